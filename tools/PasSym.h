//===- tools/PasSym.h - Reserved words of Pascal --------------------------===//
//
// The reserved words of Pascal, the language whose letter case does not matter,
// in a symbol table with a token for each word, and the test a code generator
// makes before it uses a name as an identifier.
//
// The table lives exactly as long as the unit: `InitializePasSym` builds it when
// the unit starts (when the program that links it starts), `FinalizePasSym` frees
// it when the unit stops (at the program's end), and nothing in between changes
// it. A lookup never builds it: asked after an explicit stop, it raises.
//
// Example:
//   PascalSymbols->Count();                   // 71, before any lookup
//   PasSym::IsReservedWord("Begin");          // true
//   auto* Sym = static_cast<TPascalSymbol*>(PascalSymbols->Find("type"));
//   Sym->Token;                               // 23
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

/// The 71 reserved words, case-insensitive; owned by the unit. Null before
/// `InitializePasSym` and after `FinalizePasSym`, read-only in between.
extern FK_API TSymbolTable* PascalSymbols;

/// The unit's start: builds `PascalSymbols` and notes the longest word; does nothing
/// when the table exists. A failure leaves the table null.
FK_API void InitializePasSym();
/// The unit's stop: frees `PascalSymbols` with its symbols and sets it to null.
FK_API void FinalizePasSym() noexcept;

namespace PasSym {

/// The length of the longest reserved word, in characters; 0 while the unit is stopped.
FK_API std::size_t MaxWordLength() noexcept;
/// Whether the word stands in the table, in any letter case. Raises `EInvalidOperation`
/// "The Pascal reserved words are not loaded" while the unit is stopped.
FK_API bool IsReservedWord(const detail::ShortString& AWord);
/// The same for text: false at once for a word longer than the longest reserved
/// word or with a character of U+20AC or above; otherwise the low byte of each
/// UTF-16 unit makes the key. Raises as above while the unit is stopped.
FK_API bool IsReservedWord(std::string_view AWord);

} // namespace PasSym

} // namespace formkit
