//===- tools/CppSym.h - Reserved words of C++ -----------------------------===//
//
// The reserved words of C++ and its extensions, a language whose letter case
// matters, in a symbol table with a token for each word, and the test a code
// generator makes before it uses a name as an identifier.
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

/// The 199 reserved words, case-sensitive; null before `InitializeCppSym` and
/// after `FinalizeCppSym`. Read-only in between.
extern FK_API TSymbolTable* CppSymbols;

/// Builds `CppSymbols` from the word list; does nothing when it exists.
FK_API void InitializeCppSym();
/// Frees `CppSymbols` and its symbols.
FK_API void FinalizeCppSym() noexcept;

namespace CppSym {

/// The length of the longest reserved word, in characters.
FK_API std::size_t MaxWordLength() noexcept;
/// Whether the word stands in the table in exactly this letter case.
FK_API bool IsReservedWord(const detail::ShortString& AWord);
/// The same for text: false at once for a word longer than the longest reserved
/// word or with a character of U+20AC or above; otherwise the low byte of each
/// UTF-16 unit makes the key.
FK_API bool IsReservedWord(std::string_view AWord);

} // namespace CppSym

} // namespace formkit
