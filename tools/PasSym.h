//===- tools/PasSym.h - Reserved words of Pascal --------------------------===//
//
// The reserved words of Pascal, the language whose letter case does not matter,
// in a symbol table with a token for each word, and the test a code generator
// makes before it uses a name as an identifier.
//
// Example:
//   InitializePasSym();                       // at load; also done on first use
//   PasSym::IsReservedWord("Begin");          // true
//   auto* Sym = static_cast<TPascalSymbol*>(PascalSymbols->Find("type"));
//   Sym->Token;                               // 23
//   FinalizePasSym();                         // at unload
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tools/Symbols.h"

namespace formkit {

/// A reserved word of Pascal with its token number (`SymReservedWord` when the
/// word has no token of its own).
class FK_API TPascalSymbol : public TBaseSymbol {
  FK_CLASS(TPascalSymbol, TBaseSymbol)

  TPascalSymbol() = default;
  TPascalSymbol(const detail::ShortString& AName, std::uint8_t AToken)
      : TBaseSymbol(AName), Token(AToken) {}

  std::uint8_t Token = 0;
};

/// The 71 reserved words, case-insensitive; null before `InitializePasSym` and
/// after `FinalizePasSym`. Read-only in between.
extern FK_API TSymbolTable* PascalSymbols;

/// Builds `PascalSymbols` from the word list; does nothing when it exists.
FK_API void InitializePasSym();
/// Frees `PascalSymbols` and its symbols.
FK_API void FinalizePasSym() noexcept;

namespace PasSym {

/// The length of the longest reserved word, in characters.
FK_API std::size_t MaxWordLength() noexcept;
/// Whether the word stands in the table, in any letter case.
FK_API bool IsReservedWord(const detail::ShortString& AWord);
/// The same for text: false at once for a word longer than the longest reserved
/// word or with a character of U+20AC or above; otherwise the low byte of each
/// UTF-16 unit makes the key.
FK_API bool IsReservedWord(std::string_view AWord);

} // namespace PasSym

} // namespace formkit
