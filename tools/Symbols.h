//===- tools/Symbols.h - Hash tables of named symbols ----------------------===//
//
// A small hash table of identifiers with 32 buckets, made for the reserved
// words of the languages the environment generates code for. A table owns its
// symbols; duplicates may stand side by side and the newest is found first.
// Names are short strings: at most 255 bytes of UTF-8, so the common ASCII
// lookup hashes and compares without allocating.
//
// Example:
//   TSymbolTable* Table = new TSymbolTable(stInsensitive);
//   Table->Insert(new TBaseSymbol(String("Begin")));
//   TBaseSymbol* Found = Table->Find("BEGIN");   // the symbol above
//   Table->Destroy();                            // frees the symbol too
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"

#include <algorithm>
#include <functional>
#include <vector>

namespace formkit {

namespace detail {

/// A string of at most 255 bytes held inline, like a length-prefixed short
/// string: the key form of symbols. Longer text is cut at 255 bytes (which may
/// split a UTF-8 sequence; hash and comparison still agree on the bytes kept).
class FK_API ShortString {
public:
  static constexpr std::size_t MaxLength = 255;

  ShortString() noexcept = default;
  /// Copies the first 255 bytes of `Text`.
  explicit ShortString(std::string_view Text) noexcept;

  std::size_t size() const noexcept { return FLength; }
  bool empty() const noexcept { return FLength == 0; }
  const char* data() const noexcept { return FData; }
  unsigned char operator[](std::size_t I) const noexcept {
    return static_cast<unsigned char>(FData[I]);
  }
  std::string_view View() const noexcept { return {FData, FLength}; }
  String ToString() const { return String(FData, FLength); }
  /// Appends one byte; ignored when the string is full.
  void PushBack(char C) noexcept;

  /// Exact: same length and bytes.
  friend bool operator==(const ShortString& A, const ShortString& B) noexcept {
    return A.View() == B.View();
  }

private:
  std::uint8_t FLength = 0;
  char FData[MaxLength] = {};
};

/// Folds `Text` (UTF-8) to a caseless form that does not depend on the machine's
/// locale: simple case folding of the Latin, Greek, Cyrillic, Armenian, Georgian
/// and other bicameral scripts, and of the letter-like symbols that fold onto them.
/// Malformed bytes become U+FFFD. Allocates.
FK_API String CaseFold(std::string_view Text);

/// Equality without regard to case: ASCII folding for ASCII text, `CaseFold` as
/// soon as either side holds a byte of 128 or above.
FK_API bool SameShortText(const ShortString& A, const ShortString& B);

/// The short key under which a reserved-word table looks `AWord` (UTF-8) up: one
/// byte per UTF-16 unit, its low byte. False, with no key, when the word has more
/// than `AMaxLength` units or a unit of U+20AC or above: such a word is never
/// reserved, and no hash is asked of it.
FK_API bool ReservedWordKey(std::string_view AWord, std::size_t AMaxLength, ShortString& AKey);

/// Raises `EInvalidOperation` "The %s reserved words are not loaded" for a lookup in a
/// reserved-word table whose unit has not started or has already stopped.
[[noreturn]] FK_API void RaiseReservedWordsNotLoaded(const char* Language);

} // namespace detail

/// Whether a table tells letter case apart.
enum TSymbolTableKind : std::uint8_t { stInsensitive, stCaseSensitive };

/// The comparison a table uses between a stored name and a searched one.
using TCompareSymbols = bool (*)(const detail::ShortString& A, const detail::ShortString& B);

/// The number of buckets of every table.
inline constexpr int SymbolBucketCount = 32;

/// The token of a reserved word that has no token of its own.
inline constexpr std::uint8_t SymReservedWord = 4;

/// The bucket of a name, 0 to 31. ASCII names hash their bytes directly; a name
/// with a byte of 128 or above hashes its case-folded form, so that the upper and
/// lower case of any letter share a bucket. Allocates only in that second case.
FK_API int SymbolIndex(const detail::ShortString& AName);
/// The same for text, cut to 255 bytes first as the short form would be.
FK_API int SymbolIndex(std::string_view AName);

/// A named symbol; the base of the symbols of each language. A table that holds
/// it owns it. Made with `new`, freed with `Destroy()`.
class FK_API TBaseSymbol : public TObject {
  FK_CLASS(TBaseSymbol, TObject)

  TBaseSymbol() = default;
  /// From a short string (or from 8-bit text cut to 255 bytes through it); the
  /// long form is derived when first asked for.
  explicit TBaseSymbol(const detail::ShortString& AName);
  /// From text: kept as the long form and cut to 255 bytes for the key.
  explicit TBaseSymbol(const String& AName);

  /// The next symbol of the same bucket; maintained by the table.
  TBaseSymbol* Next = nullptr;

  /// The key.
  const detail::ShortString& ShortIdent() const noexcept { return FShortIdent; }
  /// Sets the key only; the long form keeps what it had. Do not change the key of a
  /// symbol that stands in a table: its bucket would no longer match.
  void SetShortIdent(const detail::ShortString& AValue) noexcept { FShortIdent = AValue; }
  /// Sets the long form and the key.
  void SetIdent(const String& AValue);
  /// The long form, derived from the key on first use when it was not given.
  const String& GetIdent();

private:
  detail::ShortString FShortIdent;
  String FIdent;
};

/// A hash table of symbols with 32 buckets. Owns its symbols: `Clear` and
/// destruction free them, `Delete` does not. Made with `new`, freed with `Destroy()`.
class FK_API TSymbolTable : public TObject {
  FK_CLASS(TSymbolTable, TObject)

  /// A case-insensitive table (the form the class record's factory makes).
  TSymbolTable() : TSymbolTable(stInsensitive) {}
  /// An empty table comparing names as `AKind` says.
  explicit TSymbolTable(TSymbolTableKind AKind);

  /// Whether this very object stands in the table (not a symbol of the same name).
  bool Contains(TBaseSymbol* ASymbol) const noexcept;
  /// Unlinks this very object; it is not freed and becomes the caller's.
  void Delete(TBaseSymbol* ASymbol) noexcept;
  /// Puts the symbol first in its bucket and takes ownership; null is ignored.
  void Insert(TBaseSymbol* ASymbol) noexcept;
  /// The newest symbol of that name, or null.
  TBaseSymbol* Find(const detail::ShortString& AName) const;
  TBaseSymbol* Find(std::string_view AName) const;
  /// The next older symbol with the same name as `ASymbol` (which must be in the
  /// table), or null: how duplicates are visited.
  TBaseSymbol* FindNext(TBaseSymbol* ASymbol) const;
  /// The first symbol of bucket `AIndex` with that name, or null (also for an index
  /// outside 0..31).
  TBaseSymbol* FindIndex(int AIndex, const detail::ShortString& AName) const;
  TBaseSymbol* FindIndex(int AIndex, std::string_view AName) const;
  /// The first symbol of bucket `AIndex` whose key `ATest` accepts, or null.
  TBaseSymbol* FindSymbol(int AIndex,
                          const std::function<bool(const detail::ShortString&)>& ATest) const;
  /// Frees every symbol. Each bucket is detached in one atomic exchange first.
  void Clear() noexcept;
  /// Whether the table holds no symbol.
  bool Empty() const noexcept { return FCount == 0; }
  /// The number of symbols, duplicates included.
  int Count() const noexcept { return FCount; }
  /// The head of bucket `AIndex` (0..31), for walks.
  TBaseSymbol* Bucket(int AIndex) const noexcept { return FSymbolList[AIndex]; }

  /// Frees the symbols still in the table.
  void BeforeDestruction() override;

private:
  std::int32_t FCount = 0;
  TBaseSymbol* FSymbolList[SymbolBucketCount] = {};
  TCompareSymbols FCompare = nullptr;
};

/// Positional access to a table: bucket by bucket, each bucket from its newest
/// symbol. Going forward is cheap; going back starts again from bucket 0. The order
/// is only stable while the table does not change. Does not own the table.
class FK_API TTableIterator : public TObject {
  FK_CLASS(TTableIterator, TObject)

  TTableIterator() = default;
  /// Notes the table's count now; a null table gives an empty walk.
  explicit TTableIterator(TSymbolTable* ATable) noexcept;

  /// The symbol at position `AIndex`, or null outside 0..count-1.
  TBaseSymbol* GetSymbol(int AIndex) noexcept;
  /// The table's count when the iterator was made.
  int Count() const noexcept { return FCount; }

private:
  std::int32_t FLocation = -1;
  std::int32_t FIndex = -1;
  TBaseSymbol* FSymbol = nullptr;
  std::int32_t FCount = 0;
  TSymbolTable* FTable = nullptr;
};

/// A growing list of symbols that it does not own.
class FK_API TSymbolList : public TObject {
  FK_CLASS(TSymbolList, TObject)

  TSymbolList();

  /// Appends; the storage doubles when full.
  void Add(TBaseSymbol* ASymbol);
  /// Forgets the entries (the symbols stay alive) and shrinks the storage to one slot.
  void Clear();
  /// The entry at `AIndex`, or null outside the storage. Slots at or above `Count()`
  /// are null.
  TBaseSymbol* GetSymbol(int AIndex) const noexcept;
  /// The number of entries added since the last `Clear`.
  int Count() const noexcept { return FCount; }

private:
  std::vector<TBaseSymbol*> FList;
  std::int32_t FCount = 0;
};

//===----------------------------------------------------------------------===//
// Reserved-word units
//===----------------------------------------------------------------------===//

namespace detail {
/// One reserved word of a language and its token.
struct TReservedWord {
  std::uint8_t Token;
  std::string_view Word;
};

/// A table of `Words` as symbols of `TSym` (made from a name and a token), in their order;
/// `MaxLength` gets the longest word's length. The table is the caller's; a failure
/// frees what was built.
template <class TSym, std::size_t N>
[[nodiscard]] TSymbolTable* BuildReservedWords(const TReservedWord (&Words)[N], TSymbolTableKind Kind,
                                               std::size_t& MaxLength) {
  TObjectGuard<TSymbolTable> Table(new TSymbolTable(Kind));
  std::size_t Longest = 0;
  for (const TReservedWord& E : Words) {
    Table->Insert(new TSym(ShortString(E.Word), E.Token));
    Longest = std::max(Longest, E.Word.size());
  }
  MaxLength = Longest;
  return Table.Release();
}

/// A unit's load and unload: an object of this type at namespace scope in the unit's
/// file starts it when the program that links the file starts, and stops it at the end.
template <void (*Start)(), void (*Stop)() noexcept> struct TUnitLifetime {
  TUnitLifetime() { Start(); }
  ~TUnitLifetime() { Stop(); }
  TUnitLifetime(const TUnitLifetime&) = delete;
  TUnitLifetime& operator=(const TUnitLifetime&) = delete;
};
} // namespace detail

} // namespace formkit
