//===- platform/FormatSettings.h - Text forms of numbers and dates --------===//
//
// How numbers, dates and times are shown as text and read back: the global
// format settings a host may change, the float formats, and the parsers that
// answer true or false instead of raising, so an editor chooses its own message.
//
// Example:
//   const TFormatSettings& S = FormatSettings();
//   String Shown = FloatToStrF(2.5, ffGeneral, 15, 0, S);          // "2.5"
//   double V;
//   if (!TryStrToFloat(Text, V, S)) throw EConvertError(SInvalidFloat, Text);
//   TDateTime D;
//   if (TryStrToDateTime("2024-02-29 14:30", D, S)) Shown = DateTimeToStr(D, S);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <cstdint>
#include <string_view>

namespace formkit {

/// How numbers and dates are shown and read.
///
/// A format is made of the tokens `d` `dd` (day), `m` `mm` (month), `yy` `yyyy` (year),
/// `h` `hh` (hour), `n` `nn` (minute) and `s` `ss` (second), in lower case; the one-letter
/// forms have no leading zero, and `yy` is the year modulo 100. `/` stands for
/// `DateSeparator`, `:` for `TimeSeparator`, and every other character is itself.
struct TFormatSettings {
  char DecimalSeparator = '.';
  char DateSeparator = '-';
  char TimeSeparator = ':';
  String ShortDateFormat = "yyyy/mm/dd";   // '/' in a format stands for DateSeparator
  String LongTimeFormat = "hh:nn:ss";       // ':' stands for TimeSeparator
};

/// The global settings every editor reads; a host may change them. Not synchronised:
/// change them from the thread that runs the designers.
FK_API TFormatSettings& FormatSettings();

/// The forms of `FloatToStrF`: general, exponent, fixed, fixed with thousands groups (twice).
enum TFloatFormat : std::uint8_t { ffGeneral, ffExponent, ffFixed, ffNumber, ffCurrency };

/// The text of `Value`, rounded half away from zero on its exact decimal digits.
/// - `ffGeneral`: at most `Precision` (1..18) significant digits without trailing zeros;
///   fixed notation for a decimal exponent from -4 to `Precision` - 1, else "1.5E20".
/// - `ffExponent`: `Precision` mantissa digits and at least `Digits` (0..4) exponent digits
///   with a sign: "1.50000000000000E+003".
/// - `ffFixed`: `Digits` (0..18) decimals; `ffNumber` and `ffCurrency` add ',' between
///   groups of three integer digits.
/// NaN is "NAN", the infinities "INF" and "-INF"; zero never has a sign. Cost: an exact
/// decimal conversion of up to 780 digits.
FK_API String FloatToStrF(double Value, TFloatFormat Format, int Precision, int Digits,
                          const TFormatSettings& Settings);

/// Reads a decimal number: blanks, a sign, digits with at most one `DecimalSeparator`, an
/// exponent `E`/`e` with a sign and digits, blanks. No hexadecimal, no "inf" or "nan", no
/// thousands separators. False, with `Value` unchanged, on anything else or a number
/// beyond the range of a double (including one that would round to zero).
[[nodiscard]] FK_API bool TryStrToFloat(std::string_view S, double& Value, const TFormatSettings& Settings);

/// Reads an integer: blanks, a sign, decimal digits or `$`/`0x`/`0X` and hexadecimal
/// digits, blanks. Hexadecimal is the bit pattern of the type ("$FFFFFFFF" is -1 for
/// `TryStrToInt`, 4294967295 here); a minus sign before it negates the pattern modulo the
/// width of the type. False, with `Value` unchanged, on anything else or on overflow.
[[nodiscard]] FK_API bool TryStrToInt64(std::string_view S, std::int64_t& Value);
/// `TryStrToInt64` for a 32-bit integer.
[[nodiscard]] FK_API bool TryStrToInt(std::string_view S, int& Value);

/// The date part of `D` in `ShortDateFormat`: the whole days, counted back from
/// 1899-12-30 for a negative value. Raises `EConvertError` with `SInvalidDate` when the day
/// is not from 0001-01-01 to 9999-12-31 (or `D` is not finite).
FK_API String DateToStr(TDateTime D, const TFormatSettings& Settings);
/// The time part of `D` (the absolute fraction) in `LongTimeFormat`, rounded to the nearest
/// millisecond first, so 0.5 is "12:00:00". Raises `EConvertError` with `SInvalidTime` when
/// `D` is not finite.
FK_API String TimeToStr(TDateTime D, const TFormatSettings& Settings);
/// The date, and when the time part is not zero a blank and the time. A time that rounds
/// up to midnight counts to the next day. Raises `EConvertError` with `SInvalidDateTime`
/// when the date is out of range.
FK_API String DateTimeToStr(TDateTime D, const TFormatSettings& Settings);

/// Reads a date in the order of `ShortDateFormat`: one or more digits per field, the
/// settings' separators between them, blanks around. A year of one or two digits means
/// 2000 + yy below 50, else 1900 + yy. False, with `Value` unchanged, on an invalid date
/// (year 1..9999), a format without day, month or year, or trailing text.
[[nodiscard]] FK_API bool TryStrToDate(std::string_view S, TDateTime& Value, const TFormatSettings& Settings);
/// Reads a time in the order of `LongTimeFormat`; the seconds may be left out ("14:30").
/// False, with `Value` unchanged, on an invalid time or trailing text.
[[nodiscard]] FK_API bool TryStrToTime(std::string_view S, TDateTime& Value, const TFormatSettings& Settings);
/// Reads a date, optionally followed by blanks and a time. Before 1899-12-30 the time
/// counts back with the date, so "1899-12-29 06:00" is -1.25.
[[nodiscard]] FK_API bool TryStrToDateTime(std::string_view S, TDateTime& Value, const TFormatSettings& Settings);

/// "False" and "True", indexed by a Boolean.
FK_API extern const char* const BooleanIdents[2];

/// The messages of the editors that read these forms: the text, or the limits, as arguments.
FK_RESOURCESTRING(SInvalidFloat, "'%s' is not a valid floating point value");
FK_RESOURCESTRING(SInvalidDate, "'%s' is not a valid date");
FK_RESOURCESTRING(SInvalidTime, "'%s' is not a valid time");
FK_RESOURCESTRING(SInvalidDateTime, "'%s' is not a valid date and time");
FK_RESOURCESTRING(SOutOfRange, "Value must be between %d and %d");

} // namespace formkit
