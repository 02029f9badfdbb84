//===- tools/CppSym.cpp - Reserved words of C++ ---------------------------===//
#include "tools/CppSym.h"

#include "platform/TypInfoBuilder.h"

namespace formkit {

FK_IMPLEMENT(TCppSymbol, "CppSym") {}

TSymbolTable* CppSymbols = nullptr;

namespace {

// In table order: the order of insertion decides the order within a bucket.
constexpr detail::TReservedWord CppWords[] = {
    {4, "alignas"}, {4, "alignof"}, {4, "__array_rank"}, {4, "__array_extent"}, {4, "__asm"},
    {4, "_asm"}, {4, "asm"}, {4, "auto"}, {11, "__automated"}, {4, "axiom"}, {4, "_Bool"},
    {4, "bool"}, {4, "break"}, {4, "case"}, {4, "catch"}, {4, "__cdecl"}, {4, "_cdecl"},
    {4, "cdecl"}, {4, "char"}, {4, "char16_t"}, {4, "char32_t"}, {4, "class"}, {4, "__classid"},
    {4, "__classmethod"}, {4, "__closure"}, {4, "_Complex"}, {4, "concept"}, {4, "concept_map"},
    {4, "const"}, {4, "constexpr"}, {4, "const_cast"}, {4, "continue"}, {4, "__cs"}, {4, "_cs"},
    {4, "__declspec"}, {4, "decltype"}, {4, "default"}, {4, "delete"}, {4, "deleted"},
    {4, "dispid"}, {4, "__dispid"}, {4, "do"}, {4, "double"}, {4, "__ds"}, {4, "_ds"},
    {4, "dynamic_cast"}, {4, "else"}, {4, "enum"}, {4, "__es"}, {4, "_es"}, {4, "__except"},
    {4, "explicit"}, {4, "__export"}, {4, "_export"}, {4, "export"}, {4, "extern"}, {4, "false"},
    {4, "__far"}, {4, "_far"}, {4, "far"}, {4, "__fastcall"}, {4, "_fastcall"}, {4, "__fastthis"},
    {4, "__finally"}, {4, "float"}, {4, "for"}, {4, "__fortran"}, {4, "_fortran"}, {4, "friend"},
    {4, "goto"}, {4, "__has_nothrow_assign"}, {4, "__has_nothrow_copy_constructor"},
    {4, "__has_nothrow_default_constructor"}, {4, "__has_trivial_assign"},
    {4, "__has_trivial_copy_constructor"}, {4, "__has_trivial_default_constructor"},
    {4, "__has_trivial_destructor"}, {4, "__has_virtual_destructor"}, {4, "__huge"}, {4, "_huge"},
    {4, "huge"}, {4, "if"}, {4, "_Imaginary"}, {4, "__import"}, {4, "_import"}, {4, "__inline"},
    {4, "inline"}, {4, "int"}, {4, "__int8"}, {4, "__int16"}, {4, "__int32"}, {4, "__int64"},
    {4, "__int128"}, {4, "__interrupt"}, {4, "_interrupt"}, {4, "interrupt"},
    {4, "__is_abstract"}, {4, "__is_arithmetic"}, {4, "__is_array"}, {4, "__is_base_of"},
    {4, "__is_class"}, {4, "__is_complete_type"}, {4, "__is_compound"}, {4, "__is_const"},
    {4, "__is_convertible"}, {4, "__is_empty"}, {4, "__is_enum"}, {4, "__is_floating_point"},
    {4, "__is_function"}, {4, "__is_fundamental"}, {4, "__is_integral"}, {4, "__is_lvalue_expr"},
    {4, "__is_lvalue_reference"}, {4, "__is_member_function_pointer"},
    {4, "__is_member_object_pointer"}, {4, "__is_member_pointer"}, {4, "__is_object"},
    {4, "__is_pod"}, {4, "__is_pointer"}, {4, "__is_polymorphic"}, {4, "__is_reference"},
    {4, "__is_rvalue_expr"}, {4, "__is_rvalue_reference"}, {4, "__is_same"}, {4, "__is_scalar"},
    {4, "__is_signed"}, {4, "__is_standard_layout"}, {4, "__is_trivial"}, {4, "__is_union"},
    {4, "__is_unsigned"}, {4, "__is_void"}, {4, "__is_volatile"}, {4, "latecheck"},
    {4, "__loadds"}, {4, "_loadds"}, {4, "long"}, {4, "__msfastcall"}, {4, "__msreturn"},
    {4, "mutable"}, {4, "namespace"}, {4, "_near"}, {4, "__near"}, {4, "near"}, {4, "new"},
    {4, "noexcept"}, {4, "nullptr"}, {4, "operator"}, {4, "__pascal"}, {4, "_pascal"},
    {4, "pascal"}, {7, "private"}, {4, "__property"}, {4, "__protDLL"}, {8, "protected"},
    {9, "public"}, {10, "__published"}, {4, "register"}, {4, "reinterpret_cast"}, {4, "requires"},
    {4, "restrict"}, {4, "return"}, {4, "__rtti"}, {4, "__saveregs"}, {4, "_saveregs"},
    {4, "__seg"}, {4, "_seg"}, {4, "short"}, {4, "signed"}, {4, "sizeof"}, {4, "__ss"},
    {4, "_ss"}, {4, "static"}, {4, "static_assert"}, {4, "static_cast"}, {4, "__stdcall"},
    {4, "_stdcall"}, {4, "struct"}, {4, "switch"}, {4, "__syscall"}, {4, "template"}, {4, "this"},
    {4, "__thread"}, {4, "thread_local"}, {4, "throw"}, {4, "true"}, {4, "__try"}, {4, "try"},
    {4, "typedef"}, {4, "typeid"}, {4, "typename"}, {4, "union"}, {4, "unsigned"}, {4, "using"},
    {4, "__uuidof"}, {4, "virtual"}, {4, "void"}, {4, "volatile"}, {4, "wchar_t"}, {4, "while"},
};
static_assert(std::size(CppWords) == 199);

std::size_t MaxCppSymLength = 0;

} // namespace

void InitializeCppSym() {
  if (CppSymbols) return;
  CppSymbols = detail::BuildReservedWords<TCppSymbol>(CppWords, stCaseSensitive, MaxCppSymLength);
}

void FinalizeCppSym() noexcept {
  FreeAndNil(CppSymbols);
  MaxCppSymLength = 0;
}

namespace {
/// The table exists from the start of a program that links this unit, before anything asks.
const detail::TUnitLifetime<InitializeCppSym, FinalizeCppSym> CppSymUnit;
} // namespace

namespace CppSym {

std::size_t MaxWordLength() noexcept { return MaxCppSymLength; }

bool IsReservedWord(const detail::ShortString& AWord) {
  if (!CppSymbols) detail::RaiseReservedWordsNotLoaded("C++");
  return CppSymbols->Find(AWord) != nullptr;
}

bool IsReservedWord(std::string_view AWord) {
  if (!CppSymbols) detail::RaiseReservedWordsNotLoaded("C++");
  detail::ShortString Key;
  return detail::ReservedWordKey(AWord, MaxCppSymLength, Key) && IsReservedWord(Key);
}

} // namespace CppSym

} // namespace formkit
