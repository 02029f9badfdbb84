//===- platform/FormatSettings.cpp - Text forms of numbers and dates ------===//
#include "platform/FormatSettings.h"

#include <charconv>
#include <cmath>
#include <cstdio>
#include <vector>

namespace formkit {

const char* const BooleanIdents[2] = {"False", "True"};

TFormatSettings& FormatSettings() {
  static TFormatSettings* Settings = new TFormatSettings; // immortal: read during static teardown
  return *Settings;
}

//===----------------------------------------------------------------------===//
// Floats to text
//===----------------------------------------------------------------------===//

namespace {

/// A finite value as its significant decimal digits: `Digits` "d1d2..." (no trailing
/// zeros; empty for zero) with d1 standing at 10^`Exponent`.
struct TDecimal {
  String Digits;
  int Exponent = 0;
  bool Negative = false;
};

/// A double has at most 767 significant decimal digits, so this many print it exactly and
/// the C library rounds nothing away.
constexpr int ExactDigits = 780;

int Clamp(int V, int Lo, int Hi) { return V < Lo ? Lo : V > Hi ? Hi : V; }

void DropTrailingZeros(String& Digits) {
  size_t End = Digits.find_last_not_of('0');
  Digits.resize(End == String::npos ? 0 : End + 1);
}

TDecimal ExactDecimal(double V) {
  TDecimal R;
  R.Negative = std::signbit(V);
  if (V == 0) return R;
  char Buf[ExactDigits + 16];
  int Length = std::snprintf(Buf, sizeof Buf, "%.*e", ExactDigits, std::fabs(V));
  std::string_view Text(Buf, static_cast<size_t>(Length)); // "d.ddd...e-324"
  size_t E = Text.find('e');
  R.Digits.push_back(Text[0]);
  R.Digits.append(Text.substr(2, E - 2));
  DropTrailingZeros(R.Digits);
  std::string_view Exp = Text.substr(E + (Text[E + 1] == '+' ? 2 : 1));
  std::from_chars(Exp.data(), Exp.data() + Exp.size(), R.Exponent);
  return R;
}

/// Keeps the first `Keep` digits (none when negative), rounding half away from zero. The
/// digits are exact, so a first dropped digit of 5 or more is at least half a unit.
void RoundTo(TDecimal& D, int Keep) {
  if (Keep >= static_cast<int>(D.Digits.size())) return;
  if (Keep < 0) {
    D.Digits.clear();
    return;
  }
  bool Up = D.Digits[Keep] >= '5';
  D.Digits.resize(Keep);
  if (Up) {
    int I = Keep - 1;
    for (; I >= 0 && D.Digits[I] == '9'; --I) D.Digits[I] = '0';
    if (I >= 0) {
      ++D.Digits[I];
    } else { // all nines, or nothing kept: one unit more at the next place
      D.Digits.insert(D.Digits.begin(), '1');
      ++D.Exponent;
    }
  }
  DropTrailingZeros(D.Digits);
}

String Sign(const TDecimal& D) { return D.Negative && !D.Digits.empty() ? "-" : ""; }

String Grouped(const String& IntDigits) {
  String Out;
  for (size_t I = 0; I < IntDigits.size(); ++I) {
    if (I > 0 && (IntDigits.size() - I) % 3 == 0) Out.push_back(',');
    Out.push_back(IntDigits[I]);
  }
  return Out;
}

/// Positional notation with at least `MinDecimals` decimals.
String PositionalText(const TDecimal& D, int MinDecimals, char Sep, bool Group) {
  String Int = "0", Frac;
  if (!D.Digits.empty() && D.Exponent < 0) {
    Frac = String(-D.Exponent - 1, '0') + D.Digits;
  } else if (!D.Digits.empty()) {
    size_t IntLen = static_cast<size_t>(D.Exponent) + 1;
    Int = D.Digits.substr(0, IntLen);
    if (Int.size() < IntLen) Int.append(IntLen - Int.size(), '0');
    if (D.Digits.size() > IntLen) Frac = D.Digits.substr(IntLen);
  }
  if (static_cast<int>(Frac.size()) < MinDecimals) Frac.append(MinDecimals - Frac.size(), '0');
  String Out = Sign(D) + (Group ? Grouped(Int) : Int);
  if (!Frac.empty()) Out += Sep + Frac;
  return Out;
}

/// "1.5E20", "-2.25E-7": the digits as they are, no padding of the exponent.
String ScientificText(const TDecimal& D, char Sep) {
  String Out = Sign(D) + D.Digits.substr(0, 1);
  if (D.Digits.size() > 1) Out += Sep + D.Digits.substr(1);
  return Out + "E" + std::to_string(D.Exponent);
}

String GeneralText(TDecimal D, int Precision, char Sep) {
  if (D.Digits.empty()) return "0";
  RoundTo(D, Precision);
  if (D.Exponent >= -4 && D.Exponent < Precision) return PositionalText(D, 0, Sep, false);
  return ScientificText(D, Sep);
}

String ExponentText(TDecimal D, int Precision, int ExpDigits, char Sep) {
  RoundTo(D, Precision);
  String Mantissa = D.Digits.empty() ? String("0") : D.Digits;
  Mantissa.append(Precision - Mantissa.size(), '0');
  int Exp = D.Digits.empty() ? 0 : D.Exponent;
  String ExpText = std::to_string(Exp < 0 ? -Exp : Exp);
  if (static_cast<int>(ExpText.size()) < ExpDigits) ExpText.insert(0, ExpDigits - ExpText.size(), '0');
  String Out = Sign(D) + Mantissa.substr(0, 1);
  if (Precision > 1) Out += Sep + Mantissa.substr(1);
  return Out + (Exp < 0 ? "E-" : "E+") + ExpText;
}

String FixedText(TDecimal D, int Decimals, char Sep, bool Group) {
  if (!D.Digits.empty()) RoundTo(D, D.Exponent + 1 + Decimals);
  return PositionalText(D, Decimals, Sep, Group);
}

} // namespace

String FloatToStrF(double Value, TFloatFormat Kind, int Precision, int Digits, const TFormatSettings& Settings) {
  if (std::isnan(Value)) return "NAN";
  if (std::isinf(Value)) return Value < 0 ? "-INF" : "INF";
  TDecimal D = ExactDecimal(Value);
  char Sep = Settings.DecimalSeparator;
  switch (Kind) {
  case ffExponent: return ExponentText(std::move(D), Clamp(Precision, 1, 18), Clamp(Digits, 0, 4), Sep);
  case ffFixed: return FixedText(std::move(D), Clamp(Digits, 0, 18), Sep, false);
  case ffNumber:
  case ffCurrency: return FixedText(std::move(D), Clamp(Digits, 0, 18), Sep, true);
  case ffGeneral: break;
  }
  return GeneralText(std::move(D), Clamp(Precision, 1, 18), Sep);
}

//===----------------------------------------------------------------------===//
// Text to numbers
//===----------------------------------------------------------------------===//

namespace {

/// Blanks as `Trim` sees them: the space and the control characters.
bool IsBlank(char C) { return static_cast<unsigned char>(C) <= ' '; }
bool IsDigit(char C) { return C >= '0' && C <= '9'; }

std::string_view Trimmed(std::string_view S) {
  while (!S.empty() && IsBlank(S.front())) S.remove_prefix(1);
  while (!S.empty() && IsBlank(S.back())) S.remove_suffix(1);
  return S;
}

/// Copies the decimal digits at `T[I]` on to `Out`, moving `I` past them; their count.
size_t CopyDigits(std::string_view T, size_t& I, String& Out) {
  size_t Start = I;
  while (I < T.size() && IsDigit(T[I])) Out.push_back(T[I++]);
  return I - Start;
}

/// Reads an optional sign at `T[I]`: true for a minus.
bool ReadSign(std::string_view T, size_t& I) {
  if (I < T.size() && (T[I] == '+' || T[I] == '-')) return T[I++] == '-';
  return false;
}

/// The number in `T` rewritten in the one form `std::from_chars` reads whatever the
/// settings (unsigned, '.' as separator), or false when `T` is not a number.
bool PlainNumber(std::string_view T, char Sep, String& Plain) {
  size_t I = 0;
  size_t Count = CopyDigits(T, I, Plain);
  if (I < T.size() && T[I] == Sep) {
    ++I;
    Plain.push_back('.');
    Count += CopyDigits(T, I, Plain);
  }
  if (Count == 0) return false;
  if (I < T.size() && (T[I] == 'e' || T[I] == 'E')) {
    ++I;
    Plain.push_back('e');
    if (I < T.size() && (T[I] == '+' || T[I] == '-')) Plain.push_back(T[I++]);
    if (CopyDigits(T, I, Plain) == 0) return false;
  }
  return I == T.size();
}

int HexDigit(char C) {
  if (IsDigit(C)) return C - '0';
  if (C >= 'a' && C <= 'f') return C - 'a' + 10;
  if (C >= 'A' && C <= 'F') return C - 'A' + 10;
  return -1;
}

/// Reads an integer of `Bits` (32 or 64) bits into the low bits of `Out`, two's
/// complement. Decimal text must lie in the signed range; hexadecimal text is a bit
/// pattern of at most `Bits` bits, which a minus negates modulo 2^Bits.
bool ParseInteger(std::string_view S, int Bits, std::uint64_t& Out) {
  std::string_view T = Trimmed(S);
  size_t I = 0;
  bool Negative = ReadSign(T, I);
  unsigned Base = 10;
  if (I < T.size() && T[I] == '$') {
    Base = 16;
    I += 1;
  } else if (I + 1 < T.size() && T[I] == '0' && (T[I + 1] == 'x' || T[I + 1] == 'X')) {
    Base = 16;
    I += 2;
  }
  const std::uint64_t SignBit = std::uint64_t{1} << (Bits - 1);
  const std::uint64_t Max = Base == 16 ? SignBit - 1 + SignBit : Negative ? SignBit : SignBit - 1;
  if (I >= T.size()) return false;
  std::uint64_t V = 0;
  for (; I < T.size(); ++I) {
    int D = Base == 16 ? HexDigit(T[I]) : IsDigit(T[I]) ? T[I] - '0' : -1;
    if (D < 0 || V > (Max - D) / Base) return false;
    V = V * Base + D;
  }
  Out = Negative ? 0 - V : V;
  return true;
}

} // namespace

bool TryStrToFloat(std::string_view S, double& Value, const TFormatSettings& Settings) {
  std::string_view T = Trimmed(S);
  size_t I = 0;
  bool Negative = ReadSign(T, I);
  String Plain;
  if (!PlainNumber(T.substr(I), Settings.DecimalSeparator, Plain)) return false;
  double Result;
  auto [End, Error] = std::from_chars(Plain.data(), Plain.data() + Plain.size(), Result);
  // from_chars reports both overflow and a nonzero number that would round to zero.
  if (Error != std::errc() || End != Plain.data() + Plain.size()) return false;
  Value = Negative ? -Result : Result;
  return true;
}

bool TryStrToInt64(std::string_view S, std::int64_t& Value) {
  std::uint64_t Bits;
  if (!ParseInteger(S, 64, Bits)) return false;
  Value = static_cast<std::int64_t>(Bits);
  return true;
}

bool TryStrToInt(std::string_view S, int& Value) {
  std::uint64_t Bits;
  if (!ParseInteger(S, 32, Bits)) return false;
  Value = static_cast<std::int32_t>(static_cast<std::uint32_t>(Bits));
  return true;
}

//===----------------------------------------------------------------------===//
// Dates and times
//===----------------------------------------------------------------------===//

namespace {

constexpr double MinDay = -693593;  // 0001-01-01
constexpr double MaxDay = 2958465;  // 9999-12-31
constexpr long long MsPerDay = 86400000;

/// The fields a date format names; a parsed field not in the format keeps its initial
/// value (-1 for the date, so a format without a date field never reads a date).
struct TFields {
  int Year = -1, Month = -1, Day = -1;
  int Hour = 0, Minute = 0, Second = 0;
};

enum class TTokenKind : std::uint8_t { Day, Month, Year, Hour, Minute, Second, DateSep, TimeSep, Literal };

/// One element of a format: a field with its width (1, 2 or 4 digits), a separator, or a
/// literal character.
struct TToken {
  TTokenKind Kind;
  int Width = 0;
  char Literal = 0;
};

bool IsLeapYear(int Y) { return (Y % 4 == 0 && Y % 100 != 0) || Y % 400 == 0; }

int DaysInMonth(int Year, int Month) {
  static const int Days[12] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  return Month == 2 && IsLeapYear(Year) ? 29 : Days[Month - 1];
}

/// The calendar date of a day number (days since 1899-12-30), by whole 400-year eras.
TFields FieldsOfDay(long long Serial) {
  long long Z = Serial + 693899; // days since 0000-03-01, so a leap day ends each year
  long long Era = (Z >= 0 ? Z : Z - 146096) / 146097;
  long long Doe = Z - Era * 146097;
  long long Yoe = (Doe - Doe / 1460 + Doe / 36524 - Doe / 146096) / 365;
  long long Doy = Doe - (365 * Yoe + Yoe / 4 - Yoe / 100);
  long long Mp = (5 * Doy + 2) / 153; // months from March
  TFields F;
  F.Day = static_cast<int>(Doy - (153 * Mp + 2) / 5 + 1);
  F.Month = static_cast<int>(Mp < 10 ? Mp + 3 : Mp - 9);
  F.Year = static_cast<int>(Yoe + Era * 400 + (F.Month <= 2 ? 1 : 0));
  return F;
}

void SetTimeOfDay(TFields& F, long long Ms) {
  long long Seconds = Ms / 1000;
  F.Hour = static_cast<int>(Seconds / 3600);
  F.Minute = static_cast<int>(Seconds / 60 % 60);
  F.Second = static_cast<int>(Seconds % 60);
}

/// The time part of a finite value in whole milliseconds, from 0 to a whole day.
long long MsOfDay(double D) { return std::llround(std::fabs(D - std::trunc(D)) * MsPerDay); }

[[noreturn]] void RaiseInvalid(const TResString& Message, double D, const TFormatSettings& S) {
  throw EConvertError(Message, FloatToStrF(D, ffGeneral, 15, 0, S));
}

std::vector<TToken> Tokenize(std::string_view Format) {
  std::vector<TToken> Tokens;
  for (size_t I = 0; I < Format.size();) {
    char C = Format[I];
    size_t Run = Format.find_first_not_of(C, I);
    Run = (Run == std::string_view::npos ? Format.size() : Run) - I;
    int Width = Run >= 2 ? 2 : 1;
    TTokenKind Kind = TTokenKind::Literal;
    switch (C) {
    case 'd': Kind = TTokenKind::Day; break;
    case 'm': Kind = TTokenKind::Month; break;
    case 'h': Kind = TTokenKind::Hour; break;
    case 'n': Kind = TTokenKind::Minute; break;
    case 's': Kind = TTokenKind::Second; break;
    case 'y':
      if (Run >= 2) Kind = TTokenKind::Year;
      Width = Run >= 4 ? 4 : 2;
      break;
    case '/': Kind = TTokenKind::DateSep; break;
    case ':': Kind = TTokenKind::TimeSep; break;
    default: break;
    }
    if (Kind == TTokenKind::Literal || Kind == TTokenKind::DateSep || Kind == TTokenKind::TimeSep) Width = 1;
    Tokens.push_back({Kind, Width, C});
    I += Width;
  }
  return Tokens;
}

void AppendNumber(String& Out, int V, int Width) {
  String Text = std::to_string(V);
  if (static_cast<int>(Text.size()) < Width) Out.append(Width - Text.size(), '0');
  Out += Text;
}

void AppendToken(String& Out, const TToken& T, const TFields& F, const TFormatSettings& S) {
  switch (T.Kind) {
  case TTokenKind::Day: return AppendNumber(Out, F.Day, T.Width);
  case TTokenKind::Month: return AppendNumber(Out, F.Month, T.Width);
  case TTokenKind::Year: return AppendNumber(Out, T.Width == 4 ? F.Year : F.Year % 100, T.Width);
  case TTokenKind::Hour: return AppendNumber(Out, F.Hour, T.Width);
  case TTokenKind::Minute: return AppendNumber(Out, F.Minute, T.Width);
  case TTokenKind::Second: return AppendNumber(Out, F.Second, T.Width);
  case TTokenKind::DateSep: Out.push_back(S.DateSeparator); return;
  case TTokenKind::TimeSep: Out.push_back(S.TimeSeparator); return;
  case TTokenKind::Literal: Out.push_back(T.Literal); return;
  }
}

String FormatFields(std::string_view Format, const TFields& F, const TFormatSettings& S) {
  String Out;
  for (const TToken& T : Tokenize(Format)) AppendToken(Out, T, F, S);
  return Out;
}

/// The date of a day number already checked to be in range, with a time of day.
String FormatDay(double Day, long long Ms, std::string_view Format, const TFormatSettings& S) {
  TFields F = FieldsOfDay(static_cast<long long>(Day));
  SetTimeOfDay(F, Ms);
  return FormatFields(Format, F, S);
}

/// A read position in a text being parsed.
class TTextCursor {
public:
  explicit TTextCursor(std::string_view Text) : FText(Text) {}
  /// Skips blanks; how many.
  size_t SkipBlanks() {
    size_t Start = FPos;
    while (FPos < FText.size() && IsBlank(FText[FPos])) ++FPos;
    return FPos - Start;
  }
  bool AtEnd() const { return FPos == FText.size(); }
  bool Take(char C) {
    if (AtEnd() || FText[FPos] != C) return false;
    ++FPos;
    return true;
  }
  /// One or more digits; a value past 99999 stays there, so no field can overflow.
  bool ReadNumber(int& Value, int& Count) {
    Value = 0;
    Count = 0;
    for (; !AtEnd() && IsDigit(FText[FPos]); ++FPos, ++Count)
      Value = Value > 99999 ? Value : Value * 10 + (FText[FPos] - '0');
    return Count > 0;
  }

private:
  std::string_view FText;
  size_t FPos = 0;
};

void StoreField(TFields& F, TTokenKind Kind, int V, int Count) {
  switch (Kind) {
  case TTokenKind::Day: F.Day = V; break;
  case TTokenKind::Month: F.Month = V; break;
  case TTokenKind::Year: F.Year = Count <= 2 ? (V < 50 ? 2000 + V : 1900 + V) : V; break;
  case TTokenKind::Hour: F.Hour = V; break;
  case TTokenKind::Minute: F.Minute = V; break;
  case TTokenKind::Second: F.Second = V; break;
  default: break;
  }
}

bool ReadToken(TTextCursor& C, const TToken& T, TFields& F, const TFormatSettings& S) {
  switch (T.Kind) {
  case TTokenKind::DateSep: return C.Take(S.DateSeparator);
  case TTokenKind::TimeSep: return C.Take(S.TimeSeparator);
  case TTokenKind::Literal: return IsBlank(T.Literal) ? C.SkipBlanks() > 0 : C.Take(T.Literal);
  default: break;
  }
  int V, Count;
  if (!C.ReadNumber(V, Count)) return false;
  StoreField(F, T.Kind, V, Count);
  return true;
}

bool ReadTokens(TTextCursor& C, const std::vector<TToken>& Tokens, TFields& F, const TFormatSettings& S) {
  for (const TToken& T : Tokens)
    if (!ReadToken(C, T, F, S)) return false;
  return true;
}

bool IsField(const TToken& T) {
  return T.Kind != TTokenKind::DateSep && T.Kind != TTokenKind::TimeSep && T.Kind != TTokenKind::Literal;
}

/// A time format with its seconds and what separates them from the field before left out,
/// for a time written without seconds.
std::vector<TToken> WithoutSeconds(std::vector<TToken> Tokens) {
  for (size_t I = 0; I < Tokens.size(); ++I) {
    if (Tokens[I].Kind != TTokenKind::Second) continue;
    size_t First = I;
    while (First > 0 && !IsField(Tokens[First - 1])) --First;
    Tokens.erase(Tokens.begin() + First, Tokens.begin() + I + 1);
    break;
  }
  return Tokens;
}

/// Reads a time that runs to the end of the text, with or without its seconds.
bool ReadTimeToEnd(TTextCursor& C, TFields& F, const TFormatSettings& S) {
  std::vector<TToken> Full = Tokenize(S.LongTimeFormat);
  for (const std::vector<TToken>& Tokens : {Full, WithoutSeconds(Full)}) {
    TTextCursor Try = C;
    TFields Read = F;
    if (!ReadTokens(Try, Tokens, Read, S)) continue;
    Try.SkipBlanks();
    if (!Try.AtEnd()) continue;
    C = Try;
    F = Read;
    return true;
  }
  return false;
}

bool ValidDate(const TFields& F) {
  return F.Year >= 1 && F.Year <= 9999 && F.Month >= 1 && F.Month <= 12 && F.Day >= 1 &&
         F.Day <= DaysInMonth(F.Year, F.Month);
}

bool ValidTime(const TFields& F) {
  return F.Hour >= 0 && F.Hour <= 23 && F.Minute >= 0 && F.Minute <= 59 && F.Second >= 0 && F.Second <= 59;
}

/// Reads the date at the start of the text (after blanks).
bool ReadDate(TTextCursor& C, TFields& F, const TFormatSettings& S) {
  C.SkipBlanks();
  return ReadTokens(C, Tokenize(S.ShortDateFormat), F, S);
}

} // namespace

String DateToStr(TDateTime D, const TFormatSettings& Settings) {
  double Day = std::trunc(D);
  if (!(Day >= MinDay && Day <= MaxDay)) RaiseInvalid(SInvalidDate, D, Settings);
  return FormatDay(Day, 0, Settings.ShortDateFormat, Settings);
}

String TimeToStr(TDateTime D, const TFormatSettings& Settings) {
  if (!std::isfinite(D)) RaiseInvalid(SInvalidTime, D, Settings);
  return FormatDay(0, MsOfDay(D) % MsPerDay, Settings.LongTimeFormat, Settings);
}

String DateTimeToStr(TDateTime D, const TFormatSettings& Settings) {
  if (!std::isfinite(D)) RaiseInvalid(SInvalidDateTime, D, Settings);
  double Day = std::trunc(D);
  long long Ms = MsOfDay(D);
  if (Ms == MsPerDay) { // rounds up to midnight: the next day, counted the way D runs
    Ms = 0;
    Day += D < 0 ? -1 : 1;
  }
  if (!(Day >= MinDay && Day <= MaxDay)) RaiseInvalid(SInvalidDateTime, D, Settings);
  String Out = FormatDay(Day, 0, Settings.ShortDateFormat, Settings);
  if (Ms != 0) Out += ' ' + FormatDay(Day, Ms, Settings.LongTimeFormat, Settings);
  return Out;
}

bool TryStrToDate(std::string_view S, TDateTime& Value, const TFormatSettings& Settings) {
  TTextCursor C(S);
  TFields F;
  if (!ReadDate(C, F, Settings)) return false;
  C.SkipBlanks();
  if (!C.AtEnd() || !ValidDate(F) || !ValidTime(F)) return false;
  Value = EncodeDate(F.Year, F.Month, F.Day);
  return true;
}

bool TryStrToTime(std::string_view S, TDateTime& Value, const TFormatSettings& Settings) {
  TTextCursor C(S);
  TFields F;
  C.SkipBlanks();
  if (!ReadTimeToEnd(C, F, Settings) || !ValidTime(F)) return false;
  Value = EncodeTime(F.Hour, F.Minute, F.Second, 0);
  return true;
}

bool TryStrToDateTime(std::string_view S, TDateTime& Value, const TFormatSettings& Settings) {
  TTextCursor C(S);
  TFields F;
  if (!ReadDate(C, F, Settings)) return false;
  size_t Blanks = C.SkipBlanks();
  if (!C.AtEnd() && (Blanks == 0 || !ReadTimeToEnd(C, F, Settings))) return false;
  if (!ValidDate(F) || !ValidTime(F)) return false;
  TDateTime Date = EncodeDate(F.Year, F.Month, F.Day);
  TDateTime Time = EncodeTime(F.Hour, F.Minute, F.Second, 0);
  // Before day 0 the time counts back with the date, as DateTimeToStr reads it.
  Value = Date < 0 ? Date - Time : Date + Time;
  return true;
}

} // namespace formkit
