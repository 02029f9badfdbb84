//===- platform/System.cpp - Strings, exceptions, formatting, geometry ----===//
#include "platform/System.h"

#include <chrono>
#include <cmath>
#include <cstdio>
#include <ctime>
#include <map>
#include <mutex>

namespace formkit {

FK_RESOURCESTRING(SInvalidFormat, "Format '%s' invalid or incompatible with argument");
FK_RESOURCESTRING(SDateEncodeError, "Invalid argument to date encode");
FK_RESOURCESTRING(STimeEncodeError, "Invalid argument to time encode");
FK_RESOURCESTRING(SOperationAborted, "Operation aborted");

//===----------------------------------------------------------------------===//
// UTF-8 and UTF-16
//===----------------------------------------------------------------------===//

char32_t DecodeUtf8(std::string_view Text, size_t& Pos) noexcept {
  unsigned char C = static_cast<unsigned char>(Text[Pos]);
  if (C < 0x80) {
    ++Pos;
    return C;
  }
  int Extra = (C >= 0xC2 && C < 0xE0) ? 1 : (C >= 0xE0 && C < 0xF0) ? 2 : (C >= 0xF0 && C < 0xF5) ? 3 : 0;
  if (Extra == 0 || Pos + Extra >= Text.size()) {
    ++Pos;
    return 0xFFFD;
  }
  char32_t V = C & (0x3F >> Extra);
  for (int K = 1; K <= Extra; ++K) {
    unsigned char D = static_cast<unsigned char>(Text[Pos + K]);
    if ((D & 0xC0) != 0x80) {
      ++Pos;
      return 0xFFFD;
    }
    V = (V << 6) | (D & 0x3F);
  }
  static constexpr char32_t MinFor[] = {0, 0x80, 0x800, 0x10000};
  if (V < MinFor[Extra] || V > 0x10FFFF || (V >= 0xD800 && V <= 0xDFFF)) {
    ++Pos;
    return 0xFFFD;
  }
  Pos += Extra + 1;
  return V;
}

void AppendUtf8(char32_t CP, String& Out) {
  if (CP < 0x80) {
    Out.push_back(static_cast<char>(CP));
  } else if (CP < 0x800) {
    Out.push_back(static_cast<char>(0xC0 | (CP >> 6)));
    Out.push_back(static_cast<char>(0x80 | (CP & 0x3F)));
  } else if (CP < 0x10000) {
    Out.push_back(static_cast<char>(0xE0 | (CP >> 12)));
    Out.push_back(static_cast<char>(0x80 | ((CP >> 6) & 0x3F)));
    Out.push_back(static_cast<char>(0x80 | (CP & 0x3F)));
  } else {
    Out.push_back(static_cast<char>(0xF0 | (CP >> 18)));
    Out.push_back(static_cast<char>(0x80 | ((CP >> 12) & 0x3F)));
    Out.push_back(static_cast<char>(0x80 | ((CP >> 6) & 0x3F)));
    Out.push_back(static_cast<char>(0x80 | (CP & 0x3F)));
  }
}

WideString Utf8ToUtf16(std::string_view Text) {
  WideString Out;
  Out.reserve(Text.size());
  for (size_t I = 0; I < Text.size();) {
    char32_t CP = DecodeUtf8(Text, I);
    if (CP >= 0x10000) {
      CP -= 0x10000;
      Out.push_back(static_cast<char16_t>(0xD800 + (CP >> 10)));
      Out.push_back(static_cast<char16_t>(0xDC00 + (CP & 0x3FF)));
    } else {
      Out.push_back(static_cast<char16_t>(CP));
    }
  }
  return Out;
}

String Utf16ToUtf8(std::u16string_view Text) {
  String Out;
  Out.reserve(Text.size());
  for (size_t I = 0; I < Text.size(); ++I) {
    char32_t CP = Text[I];
    if (CP >= 0xD800 && CP <= 0xDBFF && I + 1 < Text.size() && Text[I + 1] >= 0xDC00 && Text[I + 1] <= 0xDFFF) {
      CP = 0x10000 + ((CP - 0xD800) << 10) + (Text[I + 1] - 0xDC00);
      ++I;
    } else if (CP >= 0xD800 && CP <= 0xDFFF) {
      CP = 0xFFFD;
    }
    AppendUtf8(CP, Out);
  }
  return Out;
}

//===----------------------------------------------------------------------===//
// Resource strings
//===----------------------------------------------------------------------===//

namespace {
struct ResOverrides {
  std::mutex Lock;
  std::map<String, String> Texts;
};
ResOverrides& Overrides() {
  static ResOverrides* Table = new ResOverrides; // immortal: used during static teardown
  return *Table;
}
} // namespace

String LoadResString(const TResString& Res) {
  auto& O = Overrides();
  std::lock_guard<std::mutex> Guard(O.Lock);
  if (!O.Texts.empty()) {
    auto It = O.Texts.find(Res.Name);
    if (It != O.Texts.end()) return It->second;
  }
  return Res.Text;
}

void SetResStringOverride(const String& Name, const String& Text) {
  auto& O = Overrides();
  std::lock_guard<std::mutex> Guard(O.Lock);
  O.Texts[Name] = Text;
}

void ClearResStringOverrides() {
  auto& O = Overrides();
  std::lock_guard<std::mutex> Guard(O.Lock);
  O.Texts.clear();
}

//===----------------------------------------------------------------------===//
// Format
//===----------------------------------------------------------------------===//

namespace {

[[noreturn]] void FormatError(std::string_view Fmt) {
  throw EConvertError(SInvalidFormat, String(Fmt));
}

String Pad(String Body, int Width, bool Left) {
  if (Width > 0 && static_cast<int>(Body.size()) < Width) {
    String Fill(Width - Body.size(), ' ');
    Body = Left ? Body + Fill : Fill + Body;
  }
  return Body;
}

String ThousandsSeparated(String Digits) {
  // Digits may carry a sign and a fraction; group the integer part only.
  size_t Start = (!Digits.empty() && Digits[0] == '-') ? 1 : 0;
  size_t End = Digits.find('.');
  if (End == String::npos) End = Digits.size();
  for (long long P = static_cast<long long>(End) - 3; P > static_cast<long long>(Start); P -= 3)
    Digits.insert(static_cast<size_t>(P), ",");
  return Digits;
}

/// The arguments of one `Format` call, handed out in order; running out is an error of
/// the format.
class TArgCursor {
public:
  TArgCursor(std::string_view Fmt, std::initializer_list<TFormatArg> Args)
      : FFmt(Fmt), FNext(Args.begin()), FEnd(Args.end()) {}
  const TFormatArg& Next() {
    if (FNext == FEnd) FormatError(FFmt);
    return *FNext++;
  }

private:
  std::string_view FFmt;
  const TFormatArg* FNext;
  const TFormatArg* FEnd;
};

/// What follows a `%`: left alignment, width, precision (-1 for none) and the
/// conversion letter in lower case.
struct TConversion {
  bool Left = false;
  int Width = 0;
  int Prec = -1;
  char Letter = 0;
};

/// A width or precision at `I`: digits, or `*` for the next argument, an integer.
void ReadNumber(std::string_view Fmt, size_t& I, TArgCursor& Args, int& Value) {
  if (I < Fmt.size() && Fmt[I] == '*') {
    const TFormatArg& A = Args.Next();
    if (A.K != TFormatArg::Kind::Int) FormatError(Fmt);
    Value = static_cast<int>(A.I);
    ++I;
    return;
  }
  while (I < Fmt.size() && Fmt[I] >= '0' && Fmt[I] <= '9') {
    Value = Value * 10 + (Fmt[I] - '0');
    if (Value > 100000) FormatError(Fmt);
    ++I;
  }
}

/// Reads a conversion from `I` (just after the `%`) to its letter, where `I` stops.
TConversion ReadConversion(std::string_view Fmt, size_t& I, TArgCursor& Args) {
  TConversion C;
  if (Fmt[I] == '-') {
    C.Left = true;
    ++I;
  }
  ReadNumber(Fmt, I, Args, C.Width);
  if (I < Fmt.size() && Fmt[I] == '.') {
    ++I;
    C.Prec = 0;
    ReadNumber(Fmt, I, Args, C.Prec);
  }
  if (I >= Fmt.size()) FormatError(Fmt);
  C.Letter = static_cast<char>(Fmt[I] | 0x20);
  return C;
}

/// `%d` and `%u`: a precision is a minimum of digits, zero padded after the sign.
String FormatDecimal(std::string_view Fmt, const TFormatArg& A, int Prec) {
  String Body;
  if (A.K == TFormatArg::Kind::Int) Body = std::to_string(A.I);
  else if (A.K == TFormatArg::Kind::UInt) Body = std::to_string(A.U);
  else FormatError(Fmt);
  if (Prec > 0) {
    bool Neg = Body[0] == '-';
    String Digits = Neg ? Body.substr(1) : Body;
    if (static_cast<int>(Digits.size()) < Prec) Digits.insert(0, Prec - Digits.size(), '0');
    Body = (Neg ? "-" : "") + Digits;
  }
  return Body;
}

/// `%x`: upper-case hexadecimal, a precision is a minimum of digits.
String FormatHex(std::string_view Fmt, const TFormatArg& A, int Prec) {
  unsigned long long V;
  if (A.K == TFormatArg::Kind::Int) V = static_cast<unsigned long long>(A.I);
  else if (A.K == TFormatArg::Kind::UInt) V = A.U;
  else FormatError(Fmt);
  char Buf[32];
  std::snprintf(Buf, sizeof Buf, "%llX", V);
  String Body = Buf;
  if (Prec > static_cast<int>(Body.size())) Body.insert(0, Prec - Body.size(), '0');
  return Body;
}

/// `%p`: sixteen hexadecimal digits.
String FormatPointer(std::string_view Fmt, const TFormatArg& A) {
  if (A.K != TFormatArg::Kind::Pointer) FormatError(Fmt);
  char Buf[32];
  std::snprintf(Buf, sizeof Buf, "%016llX", static_cast<unsigned long long>(A.U));
  return Buf;
}

/// `%s`: a precision cuts the string.
String FormatString(std::string_view Fmt, const TFormatArg& A, int Prec) {
  if (A.K != TFormatArg::Kind::Str) FormatError(Fmt);
  return (Prec >= 0 && Prec < static_cast<int>(A.S.size())) ? A.S.substr(0, Prec) : A.S;
}

/// `%f %e %g %n %m`: fixed, exponent (at least three digits: 1.50E+003), general, and
/// fixed with thousands separators; two decimals unless a precision says otherwise.
String FormatFloat(std::string_view Fmt, const TFormatArg& A, char Letter, int Prec) {
  if (A.K != TFormatArg::Kind::Float) FormatError(Fmt);
  double V = A.F;
  int P = Prec < 0 ? (Letter == 'g' ? 15 : 2) : Prec;
  char Buf[512];
  if (Letter == 'e') std::snprintf(Buf, sizeof Buf, "%.*E", P, V);
  else if (Letter == 'g') std::snprintf(Buf, sizeof Buf, "%.*G", P, V);
  else std::snprintf(Buf, sizeof Buf, "%.*f", P, V);
  String Body = Buf;
  if (Letter == 'e') {
    size_t E = Body.find('E');
    if (E != String::npos && E + 2 < Body.size())
      while (Body.size() - (E + 2) < 3) Body.insert(E + 2, "0");
  }
  if (Letter == 'n' || Letter == 'm') Body = ThousandsSeparated(Body);
  return Body;
}

/// The text of one argument under a conversion, before padding to the width.
String FormatOne(std::string_view Fmt, const TConversion& C, const TFormatArg& A) {
  switch (C.Letter) {
  case 'd':
  case 'u': return FormatDecimal(Fmt, A, C.Prec);
  case 'x': return FormatHex(Fmt, A, C.Prec);
  case 'p': return FormatPointer(Fmt, A);
  case 's': return FormatString(Fmt, A, C.Prec);
  case 'f':
  case 'e':
  case 'g':
  case 'n':
  case 'm': return FormatFloat(Fmt, A, C.Letter, C.Prec);
  default: FormatError(Fmt);
  }
}

} // namespace

String FormatArgs(std::string_view Fmt, std::initializer_list<TFormatArg> Args) {
  String Out;
  Out.reserve(Fmt.size() + 16);
  TArgCursor Cursor(Fmt, Args);
  for (size_t I = 0; I < Fmt.size(); ++I) {
    char C = Fmt[I];
    if (C != '%') {
      Out.push_back(C);
      continue;
    }
    if (++I >= Fmt.size()) FormatError(Fmt);
    if (Fmt[I] == '%') {
      Out.push_back('%');
      continue;
    }
    TConversion Conv = ReadConversion(Fmt, I, Cursor);
    const TFormatArg& A = Cursor.Next();
    Out += Pad(FormatOne(Fmt, Conv, A), Conv.Width, Conv.Left);
  }
  return Out;
}

//===----------------------------------------------------------------------===//
// Text and numbers
//===----------------------------------------------------------------------===//

namespace {
inline unsigned char FoldAscii(unsigned char C) { return (C >= 'a' && C <= 'z') ? C - 32 : C; }
} // namespace

int CompareText(std::string_view A, std::string_view B) noexcept {
  size_t N = A.size() < B.size() ? A.size() : B.size();
  for (size_t I = 0; I < N; ++I) {
    int D = FoldAscii(static_cast<unsigned char>(A[I])) - FoldAscii(static_cast<unsigned char>(B[I]));
    if (D != 0) return D;
  }
  return static_cast<int>(A.size()) - static_cast<int>(B.size());
}

bool SameText(std::string_view A, std::string_view B) noexcept {
  // Names mostly come back as they were written: equal bytes settle it without folding.
  return A.size() == B.size() && (A == B || CompareText(A, B) == 0);
}

std::uint64_t FoldedNameHash(std::string_view Name) noexcept {
  std::uint64_t H = 14695981039346656037ull;
  for (char C : Name) H = (H ^ FoldAscii(static_cast<unsigned char>(C))) * 1099511628211ull;
  return H;
}

String UpperCase(std::string_view S) {
  String R(S);
  for (char& C : R) C = static_cast<char>(FoldAscii(static_cast<unsigned char>(C)));
  return R;
}

String LowerCase(std::string_view S) {
  String R(S);
  for (char& C : R)
    if (C >= 'A' && C <= 'Z') C = static_cast<char>(C + 32);
  return R;
}

bool AnsiStartsText(std::string_view Prefix, std::string_view S) noexcept {
  return S.size() >= Prefix.size() && CompareText(S.substr(0, Prefix.size()), Prefix) == 0;
}

int AnsiCompareFileName(std::string_view A, std::string_view B) noexcept { return A.compare(B); }

namespace {
size_t ExtensionStart(std::string_view FileName) {
  size_t Dot = FileName.find_last_of("./\\:");
  if (Dot == std::string_view::npos || FileName[Dot] != '.') return FileName.size();
  return Dot;
}
} // namespace

String ExtractFileExt(std::string_view FileName) { return String(FileName.substr(ExtensionStart(FileName))); }

String ChangeFileExt(std::string_view FileName, std::string_view Ext) {
  return String(FileName.substr(0, ExtensionStart(FileName))) + String(Ext);
}

String ExtractFileName(std::string_view FileName) {
  size_t Sep = FileName.find_last_of("/\\:");
  return String(Sep == std::string_view::npos ? FileName : FileName.substr(Sep + 1));
}

String Trim(std::string_view S) {
  size_t B = 0, E = S.size();
  while (B < E && static_cast<unsigned char>(S[B]) <= ' ') ++B;
  while (E > B && static_cast<unsigned char>(S[E - 1]) <= ' ') --E;
  return String(S.substr(B, E - B));
}

bool IsValidIdent(std::string_view Name) noexcept {
  if (Name.empty() || Name.size() > 255) return false;
  auto Alpha = [](char C) { return (C >= 'a' && C <= 'z') || (C >= 'A' && C <= 'Z') || C == '_'; };
  if (!Alpha(Name[0])) return false;
  for (char C : Name)
    if (!Alpha(C) && !(C >= '0' && C <= '9')) return false;
  return true;
}

String IntToStr(long long Value) { return std::to_string(Value); }

long long StrToInt64(std::string_view S) {
  String T = Trim(S);
  size_t I = 0;
  bool Neg = false;
  if (I < T.size() && (T[I] == '-' || T[I] == '+')) Neg = T[I++] == '-';
  int Base = 10;
  if (I < T.size() && T[I] == '$') { Base = 16; ++I; }
  else if (I + 1 < T.size() && T[I] == '0' && (T[I + 1] == 'x' || T[I + 1] == 'X')) { Base = 16; I += 2; }
  if (I >= T.size()) throw EConvertError(SInvalidInteger, String(S));
  unsigned long long V = 0;
  const unsigned long long Limit = Neg ? 9223372036854775808ULL : 9223372036854775807ULL;
  for (; I < T.size(); ++I) {
    char C = T[I];
    int D = (C >= '0' && C <= '9') ? C - '0'
            : (Base == 16 && C >= 'a' && C <= 'f') ? C - 'a' + 10
            : (Base == 16 && C >= 'A' && C <= 'F') ? C - 'A' + 10 : -1;
    if (D < 0 || V > (Limit - D) / Base) throw EConvertError(SInvalidInteger, String(S));
    V = V * Base + D;
  }
  return Neg ? static_cast<long long>(0 - V) : static_cast<long long>(V);
}

int StrToInt(std::string_view S) {
  long long V = StrToInt64(S);
  if (V < INT32_MIN || V > INT32_MAX) throw EConvertError(SInvalidInteger, String(S));
  return static_cast<int>(V);
}

int MulDiv(int A, int B, int C) noexcept {
  if (C == 0) return -1;
  long long P = static_cast<long long>(A) * B;
  long long Q = P / C, R = P % C;
  // Round half away from zero: compare twice the remainder with the divisor.
  if (2 * (R < 0 ? -R : R) >= (C < 0 ? -static_cast<long long>(C) : C)) Q += ((P < 0) != (C < 0)) ? -1 : 1;
  return static_cast<int>(Q);
}

namespace {
bool IsLeapYear(int Y) { return (Y % 4 == 0 && Y % 100 != 0) || Y % 400 == 0; }
} // namespace

TDateTime EncodeDate(int Year, int Month, int Day) {
  static const int Days[2][12] = {{31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31},
                                  {31, 29, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31}};
  if (Year < 1 || Year > 9999 || Month < 1 || Month > 12 || Day < 1 ||
      Day > Days[IsLeapYear(Year)][Month - 1])
    throw EConvertError(SDateEncodeError);
  int Leap = IsLeapYear(Year);
  int DayOfYear = Day;
  for (int M = 0; M < Month - 1; ++M) DayOfYear += Days[Leap][M];
  long long Y = Year - 1;
  long long Serial = Y * 365 + Y / 4 - Y / 100 + Y / 400 + DayOfYear;
  return static_cast<double>(Serial - 693594); // 1899-12-30 is day 0
}

TDateTime EncodeTime(int Hour, int Min, int Sec, int MSec) {
  if (Hour < 0 || Hour > 23 || Min < 0 || Min > 59 || Sec < 0 || Sec > 59 || MSec < 0 || MSec > 999)
    throw EConvertError(STimeEncodeError);
  return (((Hour * 60.0 + Min) * 60.0 + Sec) * 1000.0 + MSec) / 86400000.0;
}

TDateTime Now() {
  using namespace std::chrono;
  auto T = system_clock::now();
  std::time_t TT = system_clock::to_time_t(T);
  std::tm Local{};
  localtime_r(&TT, &Local);
  int Ms = static_cast<int>(duration_cast<milliseconds>(T.time_since_epoch()).count() % 1000);
  return EncodeDate(Local.tm_year + 1900, Local.tm_mon + 1, Local.tm_mday) +
         EncodeTime(Local.tm_hour, Local.tm_min, Local.tm_sec < 60 ? Local.tm_sec : 59, Ms);
}

void Abort() { throw EAbort(SOperationAborted); }

//===----------------------------------------------------------------------===//
// Geometry
//===----------------------------------------------------------------------===//

bool IntersectRect(TRect& Out, const TRect& A, const TRect& B) noexcept {
  TRect R{A.Left > B.Left ? A.Left : B.Left, A.Top > B.Top ? A.Top : B.Top,
          A.Right < B.Right ? A.Right : B.Right, A.Bottom < B.Bottom ? A.Bottom : B.Bottom};
  if (R.IsEmpty()) {
    Out = TRect{};
    return false;
  }
  Out = R;
  return true;
}

TRect UnionRect(const TRect& A, const TRect& B) noexcept {
  if (A.IsEmpty()) return B.IsEmpty() ? TRect{} : B;
  if (B.IsEmpty()) return A;
  return {A.Left < B.Left ? A.Left : B.Left, A.Top < B.Top ? A.Top : B.Top,
          A.Right > B.Right ? A.Right : B.Right, A.Bottom > B.Bottom ? A.Bottom : B.Bottom};
}

} // namespace formkit
