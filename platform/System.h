//===- platform/System.h - Strings, exceptions, formatting, geometry -----===//
//
// The run-time library under everything: the string types, the exception
// family with resource-string messages, `Format`, name comparison, `MulDiv`,
// and the rectangle and point types (right and bottom exclusive).
//
// Example:
//   FK_RESOURCESTRING(SDuplicateName, "A component named %s already exists");
//   throw EComponentError(SDuplicateName, Name);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/ScopeGuard.h"

#include <cstdint>
#include <exception>
#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>

#define FK_API __attribute__((visibility("default")))

namespace formkit {

/// UTF-8 text: the string of every interface of the library.
using String = std::string;
/// UTF-16 text: only at wide boundaries (wide property kinds, character counts).
using WideString = std::u16string;

/// Decodes the code point at `Pos` and moves `Pos` past it; a malformed, overlong or
/// truncated sequence gives U+FFFD and moves one byte.
FK_API char32_t DecodeUtf8(std::string_view Text, size_t& Pos) noexcept;
/// Appends the UTF-8 form of `CodePoint`.
FK_API void AppendUtf8(char32_t CodePoint, String& Out);
/// Converts UTF-8 to UTF-16; malformed bytes become U+FFFD.
FK_API WideString Utf8ToUtf16(std::string_view Text);
/// Converts UTF-16 to UTF-8; unpaired surrogates become U+FFFD.
FK_API String Utf16ToUtf8(std::u16string_view Text);

//===----------------------------------------------------------------------===//
// Resource strings
//===----------------------------------------------------------------------===//

/// A message of the library, looked up by name so a host can translate it.
/// Does not own its texts: both are string literals.
struct TResString {
  const char* Name;
  const char* Text;
};

/// Declares a resource string constant `Ident` with its default text.
#define FK_RESOURCESTRING(Ident, Text) inline constexpr ::formkit::TResString Ident{#Ident, Text}

/// The text of a resource string: the host's replacement if one was loaded, else the default.
FK_API String LoadResString(const TResString& Res);
/// Replaces the text of the resource string named `Name` (a host's translation table).
FK_API void SetResStringOverride(const String& Name, const String& Text);
/// Drops every replacement given by `SetResStringOverride`.
FK_API void ClearResStringOverrides();

//===----------------------------------------------------------------------===//
// Format
//===----------------------------------------------------------------------===//

/// One argument of `Format`: an integer, a float, a string, a character or a pointer.
class FK_API TFormatArg {
public:
  enum class Kind { Int, UInt, Float, Str, Pointer };
  TFormatArg(int V) : K(Kind::Int), I(V) {}
  TFormatArg(long V) : K(Kind::Int), I(V) {}
  TFormatArg(long long V) : K(Kind::Int), I(V) {}
  TFormatArg(unsigned V) : K(Kind::UInt), U(V) {}
  TFormatArg(unsigned long V) : K(Kind::UInt), U(V) {}
  TFormatArg(unsigned long long V) : K(Kind::UInt), U(V) {}
  TFormatArg(double V) : K(Kind::Float), F(V) {}
  TFormatArg(char V) : K(Kind::Str), S(1, V) {}
  TFormatArg(const char* V) : K(Kind::Str), S(V ? V : "") {}
  TFormatArg(std::string_view V) : K(Kind::Str), S(V) {}
  TFormatArg(const String& V) : K(Kind::Str), S(V) {}
  TFormatArg(const void* V) : K(Kind::Pointer), U(reinterpret_cast<std::uintptr_t>(V)) {}
  TFormatArg(bool) = delete; // ambiguous in messages: say "True"/"False" explicitly

  Kind K;
  long long I = 0;
  unsigned long long U = 0;
  double F = 0;
  String S;
};

/// Formats like the run-time library: `%s %d %u %x %f %g %e %n %m %p %%`, with `-`,
/// width, `.precision` and `*`. An argument of the wrong kind or a missing one raises
/// `EConvertError` "Format '%s' invalid or incompatible with argument".
FK_API String FormatArgs(std::string_view Fmt, std::initializer_list<TFormatArg> Args);

template <class... A> String Format(std::string_view Fmt, const A&... Args) {
  return FormatArgs(Fmt, {TFormatArg(Args)...});
}

//===----------------------------------------------------------------------===//
// Text and numbers
//===----------------------------------------------------------------------===//

/// Compares without regard to ASCII case, byte by byte: <0, 0 or >0.
FK_API int CompareText(std::string_view A, std::string_view B) noexcept;
/// True when `CompareText` is 0.
FK_API bool SameText(std::string_view A, std::string_view B) noexcept;
/// A hash of a name that agrees with `SameText`: FNV-1a over the name folded to ASCII upper
/// case. For tables of names looked up without regard to case.
FK_API std::uint64_t FoldedNameHash(std::string_view Name) noexcept;
/// ASCII upper and lower case; other bytes unchanged.
FK_API String UpperCase(std::string_view S);
FK_API String LowerCase(std::string_view S);
/// True when `S` starts with `Prefix` without regard to case.
FK_API bool AnsiStartsText(std::string_view Prefix, std::string_view S) noexcept;
/// File names compare as the file system does; here case-sensitive.
FK_API int AnsiCompareFileName(std::string_view A, std::string_view B) noexcept;
/// The extension of a file name with its dot, or empty.
FK_API String ExtractFileExt(std::string_view FileName);
/// Replaces (or adds) the extension; `Ext` carries its dot.
FK_API String ChangeFileExt(std::string_view FileName, std::string_view Ext);
/// The name without its directory.
FK_API String ExtractFileName(std::string_view FileName);
/// Whitespace and control characters removed from both ends.
FK_API String Trim(std::string_view S);
/// True when `Name` is a valid identifier: a letter or `_`, then letters, digits, `_`.
FK_API bool IsValidIdent(std::string_view Name) noexcept;
/// The message of a text that is no integer.
FK_RESOURCESTRING(SInvalidInteger, "'%s' is not a valid integer value");
/// The message of an argument that is not one of those a call accepts.
FK_RESOURCESTRING(SArgumentInvalid, "Invalid argument");
/// Decimal text of an integer.
FK_API String IntToStr(long long Value);
/// Parses a decimal or `$`-prefixed hexadecimal integer; raises `EConvertError`
/// "'%s' is not a valid integer value".
FK_API long long StrToInt64(std::string_view S);
FK_API int StrToInt(std::string_view S);

/// (A * B) / C with the product in 64 bits, rounded half away from zero; -1 when C is 0.
FK_API int MulDiv(int A, int B, int C) noexcept;

/// Days since 1899-12-30 with the time as fraction.
using TDateTime = double;
FK_API TDateTime Now();
/// Raises `EConvertError` "Invalid argument to date encode" for an invalid date.
FK_API TDateTime EncodeDate(int Year, int Month, int Day);
/// Raises `EConvertError` "Invalid argument to time encode" for an invalid time.
FK_API TDateTime EncodeTime(int Hour, int Min, int Sec, int MSec);

//===----------------------------------------------------------------------===//
// Exceptions
//===----------------------------------------------------------------------===//

/// Base of every exception of the library: a UTF-8 message and a class name.
class FK_API Exception : public std::exception {
public:
  explicit Exception(String Msg) : FMessage(std::move(Msg)) {}
  explicit Exception(const TResString& Res) : FMessage(LoadResString(Res)) {}
  template <class... A>
    requires(sizeof...(A) > 0)
  Exception(std::string_view Fmt, const A&... Args) : FMessage(Format(Fmt, Args...)) {}
  template <class... A>
    requires(sizeof...(A) > 0)
  Exception(const TResString& Res, const A&... Args)
      : FMessage(Format(LoadResString(Res), Args...)) {}

  const String& Message() const noexcept { return FMessage; }
  void SetMessage(String Msg) { FMessage = std::move(Msg); }
  const char* what() const noexcept override { return FMessage.c_str(); }
  virtual const char* ClassName() const noexcept { return "Exception"; }

private:
  String FMessage;
};

/// Declares exception class `Name` deriving from `Parent` with all its constructors.
#define FK_EXCEPTION(Name, Parent)                                                                 \
  class FK_API Name : public Parent {                                                              \
  public:                                                                                          \
    using Parent::Parent;                                                                          \
    const char* ClassName() const noexcept override { return #Name; }                              \
  }

/// The silent exception: stops an operation and shows nothing.
FK_EXCEPTION(EAbort, Exception);
FK_EXCEPTION(EConvertError, Exception);
FK_EXCEPTION(EArgumentException, Exception);
FK_EXCEPTION(EArgumentOutOfRangeException, EArgumentException);
FK_EXCEPTION(EListError, Exception);
FK_EXCEPTION(EStringListError, Exception);
FK_EXCEPTION(EInvalidOperation, Exception);
FK_EXCEPTION(EInvalidCast, Exception);
/// The message of a class cast that does not hold.
FK_RESOURCESTRING(SInvalidCast, "Invalid class typecast");
FK_EXCEPTION(EIntfCastError, Exception);
FK_EXCEPTION(EInvalidPointer, Exception);
FK_EXCEPTION(ENonAIRException, Exception);
/// The design core's own exception.
FK_EXCEPTION(EComponentDesignerException, ENonAIRException);

/// Raises the silent `EAbort`.
[[noreturn]] FK_API void Abort();

//===----------------------------------------------------------------------===//
// Geometry
//===----------------------------------------------------------------------===//

/// A point of two integers.
struct TPoint {
  int X = 0;
  int Y = 0;
  friend bool operator==(const TPoint&, const TPoint&) = default;
};

/// A rectangle; right and bottom are exclusive, so an empty one has Right <= Left.
struct TRect {
  int Left = 0;
  int Top = 0;
  int Right = 0;
  int Bottom = 0;

  int Width() const noexcept { return Right - Left; }
  int Height() const noexcept { return Bottom - Top; }
  TPoint TopLeft() const noexcept { return {Left, Top}; }
  TPoint BottomRight() const noexcept { return {Right, Bottom}; }
  bool IsEmpty() const noexcept { return Right <= Left || Bottom <= Top; }
  /// True when the point lies inside; right and bottom edges are outside.
  bool Contains(TPoint P) const noexcept {
    return P.X >= Left && P.X < Right && P.Y >= Top && P.Y < Bottom;
  }
  void Offset(int DX, int DY) noexcept { Left += DX; Right += DX; Top += DY; Bottom += DY; }
  friend bool operator==(const TRect&, const TRect&) = default;
};

inline TRect Rect(int Left, int Top, int Right, int Bottom) { return {Left, Top, Right, Bottom}; }
inline TRect Bounds(int Left, int Top, int Width, int Height) {
  return {Left, Top, Left + Width, Top + Height};
}
inline TPoint Point(int X, int Y) { return {X, Y}; }
/// The overlap of two rectangles; false and an empty rectangle when they do not overlap.
FK_API bool IntersectRect(TRect& Out, const TRect& A, const TRect& B) noexcept;
/// The smallest rectangle holding both; an empty operand is ignored.
FK_API TRect UnionRect(const TRect& A, const TRect& B) noexcept;

} // namespace formkit
