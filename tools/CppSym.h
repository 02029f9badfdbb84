//===- tools/CppSym.h - Reserved words of C++ -----------------------------===//
//
// The reserved words of C++ and its extensions, a language whose letter case
// matters, in a symbol table with a token for each word, and the test a code
// generator makes before it uses a name as an identifier.
//
// The table lives exactly as long as the unit: `InitializeCppSym` builds it when
// the unit starts (when the program that links it starts), `FinalizeCppSym` frees
// it when the unit stops (at the program's end), and nothing in between changes
// it. A lookup never builds it: asked after an explicit stop, it raises.
//
// Example:
//   CppSym::IsReservedWord("class");          // true
//   CppSym::IsReservedWord("Class");          // false: case matters here
//   auto* Sym = static_cast<TCppSymbol*>(CppSymbols->Find("public"));
//   Sym->Token;                               // 9
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tools/Symbols.h"

namespace formkit {

/// A reserved word of C++ with its token number (`SymReservedWord` when the word
/// has no token of its own).
class FK_API TCppSymbol : public TBaseSymbol {
  FK_CLASS(TCppSymbol, TBaseSymbol)

  TCppSymbol() = default;
  TCppSymbol(const detail::ShortString& AName, std::uint8_t AToken)
      : TBaseSymbol(AName), Token(AToken) {}

  std::uint8_t Token = 0;
};

/// The 199 reserved words, case-sensitive; owned by the unit. Null before
/// `InitializeCppSym` and after `FinalizeCppSym`, read-only in between.
extern FK_API TSymbolTable* CppSymbols;

/// The unit's start: builds `CppSymbols` and notes the longest word; does nothing
/// when the table exists. A failure leaves the table null.
FK_API void InitializeCppSym();
/// The unit's stop: frees `CppSymbols` with its symbols and sets it to null.
FK_API void FinalizeCppSym() noexcept;

namespace CppSym {

/// The length of the longest reserved word, in characters; 0 while the unit is stopped.
FK_API std::size_t MaxWordLength() noexcept;
/// Whether the word stands in the table in exactly this letter case. Raises
/// `EInvalidOperation` "The C++ reserved words are not loaded" while the unit is stopped.
FK_API bool IsReservedWord(const detail::ShortString& AWord);
/// The same for text: false at once for a word longer than the longest reserved
/// word or with a character of U+20AC or above; otherwise the low byte of each
/// UTF-16 unit makes the key. Raises as above while the unit is stopped.
FK_API bool IsReservedWord(std::string_view AWord);

} // namespace CppSym

} // namespace formkit
