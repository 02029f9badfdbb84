//===- tests/platform/FormatSettingsTest.cpp - Numbers and dates as text --===//
#include "platform/FormatSettings.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

using namespace formkit;

namespace {

const TFormatSettings Plain; // the settings as shipped: '.', '-', ':', "yyyy/mm/dd", "hh:nn:ss"

String General(double V, int Precision = 15) { return FloatToStrF(V, ffGeneral, Precision, 0, Plain); }

/// The message of the `EConvertError` that `Fn` raises, or a note that it raised none.
template <class F> String ConvertErrorOf(F&& Fn) {
  try {
    Fn();
  } catch (const EConvertError& E) {
    return E.Message();
  }
  return "(nothing raised)";
}

constexpr double Sentinel = -12345.5;

} // namespace

//===----------------------------------------------------------------------===//
// Floats to text
//===----------------------------------------------------------------------===//

TEST(FloatText, GeneralFormShowsTheShortestFixedOrScientificText) {
  EXPECT_EQ(General(0.1), "0.1");
  EXPECT_EQ(General(1.0 / 3.0), "0.333333333333333");
  EXPECT_EQ(General(100), "100");
  EXPECT_EQ(General(1e15), "1E15");
  EXPECT_EQ(General(123456789012345.0), "123456789012345");
  EXPECT_EQ(General(0.00001), "1E-5");
  EXPECT_EQ(General(0.0001), "0.0001");
  EXPECT_EQ(General(-1.5), "-1.5");
  EXPECT_EQ(General(1e300), "1E300");
  EXPECT_EQ(General(5e-324), "4.94065645841247E-324");
  EXPECT_EQ(General(static_cast<double>(0.1f), 7), "0.1");
  EXPECT_EQ(General(1.5e20), "1.5E20");
  EXPECT_EQ(General(1e-6), "1E-6");
  EXPECT_EQ(General(-2.25e-7), "-2.25E-7");
  EXPECT_EQ(General(-0.00012), "-0.00012");
  EXPECT_EQ(General(1234567.0, 4), "1.235E6"); // the exponent reaches the precision
  EXPECT_EQ(General(123.0, 3), "123");
}

TEST(FloatText, GeneralFormRoundsHalfAwayFromZeroOnTheExactDigits) {
  EXPECT_EQ(General(2.5, 1), "3");
  EXPECT_EQ(General(-2.5, 1), "-3");
  EXPECT_EQ(General(3.5, 1), "4");
  EXPECT_EQ(General(0.125, 2), "0.13");     // an exact tie goes up, not to even
  EXPECT_EQ(General(0.15, 1), "0.1");       // 0.1499999999999999944...
  EXPECT_EQ(General(9.96, 2), "10");        // the carry moves the exponent
  EXPECT_EQ(General(999999999999999.9), "1E15");
  EXPECT_EQ(General(0.000099999999, 3), "0.0001");
  // The precision is clamped to 1..18.
  EXPECT_EQ(General(2.5, 0), "3");
  EXPECT_EQ(General(2.5, -4), "3");
  EXPECT_EQ(General(0.1, 16), "0.1");
  EXPECT_EQ(General(0.1, 17), "0.10000000000000001"); // 0.1000000000000000055511...
  EXPECT_EQ(General(0.1, 40), "0.100000000000000006");
  EXPECT_EQ(General(1.0 / 3.0, 40), "0.333333333333333315");
}

TEST(FloatText, ZeroInfinitiesAndNaNHaveFixedTexts) {
  EXPECT_EQ(General(0.0), "0");
  EXPECT_EQ(General(-0.0), "0");
  EXPECT_EQ(General(std::numeric_limits<double>::quiet_NaN()), "NAN");
  EXPECT_EQ(General(std::numeric_limits<double>::infinity()), "INF");
  EXPECT_EQ(General(-std::numeric_limits<double>::infinity()), "-INF");
  for (TFloatFormat F : {ffExponent, ffFixed, ffNumber, ffCurrency}) {
    EXPECT_EQ(FloatToStrF(std::numeric_limits<double>::quiet_NaN(), F, 15, 2, Plain), "NAN");
    EXPECT_EQ(FloatToStrF(-std::numeric_limits<double>::infinity(), F, 15, 2, Plain), "-INF");
  }
  EXPECT_EQ(FloatToStrF(-0.0, ffFixed, 15, 2, Plain), "0.00");
  EXPECT_EQ(FloatToStrF(-0.0, ffExponent, 3, 2, Plain), "0.00E+00");
}

TEST(FloatText, ExponentFormHasAFixedMantissaAndASignedExponent) {
  EXPECT_EQ(FloatToStrF(1500, ffExponent, 15, 3, Plain), "1.50000000000000E+003");
  EXPECT_EQ(FloatToStrF(0.00015, ffExponent, 3, 2, Plain), "1.50E-04");
  EXPECT_EQ(FloatToStrF(-1e300, ffExponent, 2, 0, Plain), "-1.0E+300");
  EXPECT_EQ(FloatToStrF(9.9996, ffExponent, 4, 1, Plain), "1.000E+1");
  EXPECT_EQ(FloatToStrF(25, ffExponent, 1, 1, Plain), "3E+1");
  EXPECT_EQ(FloatToStrF(0, ffExponent, 3, 2, Plain), "0.00E+00");
  EXPECT_EQ(FloatToStrF(1, ffExponent, 2, 9, Plain), "1.0E+0000"); // at most four digits
}

TEST(FloatText, FixedAndNumberFormsHaveTheirDecimals) {
  EXPECT_EQ(FloatToStrF(123, ffFixed, 15, 2, Plain), "123.00");
  EXPECT_EQ(FloatToStrF(2.5, ffFixed, 15, 0, Plain), "3");
  EXPECT_EQ(FloatToStrF(0.125, ffFixed, 15, 2, Plain), "0.13");
  EXPECT_EQ(FloatToStrF(1.005, ffFixed, 15, 2, Plain), "1.00"); // 1.00499999999999989...
  EXPECT_EQ(FloatToStrF(0.006, ffFixed, 15, 2, Plain), "0.01");
  EXPECT_EQ(FloatToStrF(0.004, ffFixed, 15, 2, Plain), "0.00");
  EXPECT_EQ(FloatToStrF(-0.001, ffFixed, 15, 2, Plain), "0.00");
  EXPECT_EQ(FloatToStrF(-99.999, ffFixed, 15, 2, Plain), "-100.00");
  EXPECT_EQ(FloatToStrF(1e20, ffFixed, 15, 0, Plain), "100000000000000000000");
  EXPECT_EQ(FloatToStrF(1.5, ffFixed, 15, -3, Plain), "2");
  EXPECT_EQ(FloatToStrF(1234567.891, ffNumber, 15, 2, Plain), "1,234,567.89");
  EXPECT_EQ(FloatToStrF(-1234.5, ffNumber, 15, 1, Plain), "-1,234.5");
  EXPECT_EQ(FloatToStrF(999.999, ffNumber, 15, 2, Plain), "1,000.00");
  EXPECT_EQ(FloatToStrF(123, ffNumber, 15, 0, Plain), "123");
  EXPECT_EQ(FloatToStrF(123456, ffCurrency, 15, 2, Plain), "123,456.00");
}

TEST(FloatText, TheDecimalSeparatorComesFromTheSettings) {
  TFormatSettings Comma;
  Comma.DecimalSeparator = ',';
  EXPECT_EQ(FloatToStrF(0.5, ffGeneral, 15, 0, Comma), "0,5");
  EXPECT_EQ(FloatToStrF(1.5e20, ffGeneral, 15, 0, Comma), "1,5E20");
  EXPECT_EQ(FloatToStrF(1500, ffExponent, 3, 3, Comma), "1,50E+003");
  EXPECT_EQ(FloatToStrF(2.25, ffFixed, 15, 1, Comma), "2,3");
}

TEST(FloatText, SeventeenDigitsReadBackToTheSameDouble) {
  for (double V : {0.1, 1.0 / 3.0, -2.2250738585072014e-308, 5e-324, 1.7976931348623157e308, 123456.789,
                   -9.87654321e-12, 4503599627370497.0}) {
    String Text = General(V, 17);
    double Back = 0;
    ASSERT_TRUE(TryStrToFloat(Text, Back, Plain)) << Text;
    EXPECT_EQ(Back, V) << Text;
  }
}

//===----------------------------------------------------------------------===//
// Text to floats
//===----------------------------------------------------------------------===//

TEST(FloatParsing, ReadsSignedDecimalsWithAnExponent) {
  struct Case {
    const char* Text;
    double Expected;
  };
  for (Case C : {Case{"1.5", 1.5}, Case{"  -2  ", -2}, Case{"+.5", 0.5}, Case{"5.", 5}, Case{"1e3", 1000},
                 Case{"1E-3", 0.001}, Case{"2.5e+2", 250}, Case{"\t007\t", 7}, Case{"-0", 0},
                 Case{"4.94065645841247E-324", 5e-324}, Case{"1.7976931348623157e308", 1.7976931348623157e308},
                 Case{"0e999999999999", 0}}) {
    double V = Sentinel;
    EXPECT_TRUE(TryStrToFloat(C.Text, V, Plain)) << C.Text;
    EXPECT_EQ(V, C.Expected) << C.Text;
  }
  double V = 0;
  ASSERT_TRUE(TryStrToFloat("-0", V, Plain));
  EXPECT_TRUE(std::signbit(V));
}

TEST(FloatParsing, RejectsOtherTextAndLeavesTheValue) {
  for (const char* Bad : {"", "  ", ".", "-", "+-1", "- 1", "e5", "1e", "1e+", "1e-x", "0x10", "$10", "inf", "-INF",
                          "nan", "1,000", "1.2.3", "--1", "1 2", "1.5x", "1e400", "-1e400", "1e-400", "1,5"}) {
    double V = Sentinel;
    EXPECT_FALSE(TryStrToFloat(Bad, V, Plain)) << Bad;
    EXPECT_EQ(V, Sentinel) << Bad;
  }
}

TEST(FloatParsing, OnlyTheSettingsSeparatorIsADecimalSeparator) {
  TFormatSettings Comma;
  Comma.DecimalSeparator = ',';
  double V = Sentinel;
  EXPECT_FALSE(TryStrToFloat("0.5", V, Comma));
  EXPECT_EQ(V, Sentinel);
  EXPECT_TRUE(TryStrToFloat("0,5", V, Comma));
  EXPECT_EQ(V, 0.5);
  EXPECT_TRUE(TryStrToFloat("-1,25E2", V, Comma));
  EXPECT_EQ(V, -125);
  EXPECT_FALSE(TryStrToFloat("1,2,3", V, Comma));
}

//===----------------------------------------------------------------------===//
// Text to integers
//===----------------------------------------------------------------------===//

TEST(IntegerParsing, ReadsDecimalAndHexadecimal) {
  int I = 0;
  std::int64_t L = 0;
  EXPECT_TRUE(TryStrToInt("42", I) && I == 42);
  EXPECT_TRUE(TryStrToInt(" -42 ", I) && I == -42);
  EXPECT_TRUE(TryStrToInt("+7", I) && I == 7);
  EXPECT_TRUE(TryStrToInt("$FF", I) && I == 255);
  EXPECT_TRUE(TryStrToInt("0x1f", I) && I == 31);
  EXPECT_TRUE(TryStrToInt("0XaB", I) && I == 171);
  EXPECT_TRUE(TryStrToInt("-$10", I) && I == -16);
  EXPECT_TRUE(TryStrToInt("$000000000000FF", I) && I == 255); // leading zeros are no overflow
  EXPECT_TRUE(TryStrToInt64("0x7FFFFFFFFFFFFFFF", L) && L == INT64_MAX);
  EXPECT_TRUE(TryStrToInt64("  123456789012  ", L) && L == 123456789012);
}

TEST(IntegerParsing, HexadecimalIsTheBitPatternOfTheType) {
  int I = 0;
  std::int64_t L = 0;
  EXPECT_TRUE(TryStrToInt("$FFFFFFFF", I));
  EXPECT_EQ(I, -1);
  EXPECT_TRUE(TryStrToInt64("$FFFFFFFF", L));
  EXPECT_EQ(L, 4294967295);
  EXPECT_TRUE(TryStrToInt("$80000000", I));
  EXPECT_EQ(I, INT32_MIN);
  EXPECT_TRUE(TryStrToInt64("$FFFFFFFFFFFFFFFF", L));
  EXPECT_EQ(L, -1);
  EXPECT_TRUE(TryStrToInt64("0x8000000000000000", L));
  EXPECT_EQ(L, INT64_MIN);
  EXPECT_TRUE(TryStrToInt("-$FFFFFFFF", I)); // the pattern negated modulo 2^32
  EXPECT_EQ(I, 1);
}

TEST(IntegerParsing, LimitsOfTheTypes) {
  int I = 0;
  std::int64_t L = 0;
  EXPECT_TRUE(TryStrToInt("2147483647", I) && I == INT32_MAX);
  EXPECT_TRUE(TryStrToInt("-2147483648", I) && I == INT32_MIN);
  EXPECT_TRUE(TryStrToInt64("9223372036854775807", L) && L == INT64_MAX);
  EXPECT_TRUE(TryStrToInt64("-9223372036854775808", L) && L == INT64_MIN);
  I = 5;
  L = 5;
  for (const char* Over : {"2147483648", "-2147483649", "$100000000", "0x1FFFFFFFF", "99999999999999999999"}) {
    EXPECT_FALSE(TryStrToInt(Over, I)) << Over;
    EXPECT_EQ(I, 5) << Over;
  }
  for (const char* Over : {"9223372036854775808", "-9223372036854775809", "$10000000000000000",
                           "184467440737095516150", "0x1FFFFFFFFFFFFFFFF"}) {
    EXPECT_FALSE(TryStrToInt64(Over, L)) << Over;
    EXPECT_EQ(L, 5) << Over;
  }
}

TEST(IntegerParsing, RejectsOtherTextAndLeavesTheValue) {
  for (const char* Bad : {"", "   ", "-", "+", "$", "0x", "-0x", "12a", "1 2", "$G", "0xG1", "1.0", "0x-1", "- 1",
                          "--1", "1e3", "x10", "$ 1", "١٢"}) {
    int I = 5;
    std::int64_t L = 5;
    EXPECT_FALSE(TryStrToInt(Bad, I)) << Bad;
    EXPECT_FALSE(TryStrToInt64(Bad, L)) << Bad;
    EXPECT_EQ(I, 5) << Bad;
    EXPECT_EQ(L, 5) << Bad;
  }
}

TEST(IntegerParsing, AgreesWithTheRaisingParserWhereBothAccept) {
  for (const char* Text : {"0", "-0", " 17 ", "-2147483648", "$7FFFFFFF", "0x10", "-$10", "9223372036854775807",
                           "-9223372036854775808"}) {
    std::int64_t L = 0;
    ASSERT_TRUE(TryStrToInt64(Text, L)) << Text;
    EXPECT_EQ(L, StrToInt64(Text)) << Text;
  }
}

//===----------------------------------------------------------------------===//
// Dates and times to text
//===----------------------------------------------------------------------===//

TEST(DateText, DatesTimesAndBothInTheDefaultFormats) {
  TDateTime Leap = EncodeDate(2024, 2, 29);
  EXPECT_EQ(DateToStr(Leap, Plain), "2024-02-29");
  EXPECT_EQ(DateToStr(Leap + EncodeTime(23, 59, 59, 999), Plain), "2024-02-29");
  EXPECT_EQ(TimeToStr(0.5, Plain), "12:00:00");
  EXPECT_EQ(TimeToStr(Leap + EncodeTime(14, 30, 15, 999), Plain), "14:30:15");
  EXPECT_EQ(TimeToStr(0.5 - 1e-12, Plain), "12:00:00"); // rounded to the millisecond first
  EXPECT_EQ(TimeToStr(0, Plain), "00:00:00");
  EXPECT_EQ(DateTimeToStr(Leap, Plain), "2024-02-29");
  EXPECT_EQ(DateTimeToStr(Leap + EncodeTime(14, 30, 0, 0), Plain), "2024-02-29 14:30:00");
  EXPECT_EQ(DateTimeToStr(Leap + EncodeTime(0, 0, 0, 1), Plain), "2024-02-29 00:00:00");
  EXPECT_EQ(DateToStr(0, Plain), "1899-12-30");
  EXPECT_EQ(DateToStr(EncodeDate(1, 1, 1), Plain), "0001-01-01");
  EXPECT_EQ(DateToStr(EncodeDate(9999, 12, 31) + 0.5, Plain), "9999-12-31");
}

TEST(DateText, ATimeThatRoundsToMidnightCountsToTheNextDay) {
  TDateTime AlmostMidnight = 0.9999999999;
  EXPECT_EQ(TimeToStr(AlmostMidnight, Plain), "00:00:00");
  EXPECT_EQ(DateTimeToStr(EncodeDate(2023, 12, 31) + AlmostMidnight, Plain), "2024-01-01");
  EXPECT_EQ(DateTimeToStr(-1 - AlmostMidnight, Plain), "1899-12-28");
}

TEST(DateText, NegativeValuesCountBackWithAPositiveTime) {
  EXPECT_EQ(DateToStr(-1, Plain), "1899-12-29");
  EXPECT_EQ(DateToStr(-1.25, Plain), "1899-12-29");
  EXPECT_EQ(TimeToStr(-1.25, Plain), "06:00:00");
  EXPECT_EQ(DateTimeToStr(-1.25, Plain), "1899-12-29 06:00:00");
  EXPECT_EQ(DateTimeToStr(EncodeDate(1752, 9, 14) - EncodeTime(8, 5, 3, 0), Plain), "1752-09-14 08:05:03");
  // Between -1 and 0 the day is day 0 either way, so the value reads back positive.
  EXPECT_EQ(DateTimeToStr(-0.75, Plain), "1899-12-30 18:00:00");
}

TEST(DateText, TokensSeparatorsAndLiterals) {
  TFormatSettings S;
  S.DateSeparator = '.';
  S.TimeSeparator = '.';
  S.ShortDateFormat = "d/m/yy";
  S.LongTimeFormat = "h:n:s UTC"; // tokens are lower case: the capitals are literal
  TDateTime D = EncodeDate(2005, 3, 7) + EncodeTime(9, 5, 4, 0);
  EXPECT_EQ(DateToStr(D, S), "7.3.05");
  EXPECT_EQ(TimeToStr(D, S), "9.5.4 UTC");
  EXPECT_EQ(DateTimeToStr(D, S), "7.3.05 9.5.4 UTC");
  S.ShortDateFormat = "[dd|mm|yyyy] ddd y";
  EXPECT_EQ(DateToStr(D, S), "[07|03|2005] 077 y"); // "ddd" is "dd" and "d"; a lone "y" is itself
  S.ShortDateFormat = "yyyy/mm/dd hh:nn";
  EXPECT_EQ(DateToStr(D, S), "2005.03.07 00.00"); // the date part only
}

TEST(DateText, ValuesOutsideTheCalendarRaise) {
  EXPECT_EQ(ConvertErrorOf([] { (void)DateToStr(1e300, Plain); }), "'1E300' is not a valid date");
  EXPECT_EQ(ConvertErrorOf([] { (void)DateToStr(EncodeDate(1, 1, 1) - 1, Plain); }),
            "'-693594' is not a valid date");
  EXPECT_EQ(ConvertErrorOf([] { (void)DateToStr(EncodeDate(9999, 12, 31) + 1, Plain); }),
            "'2958466' is not a valid date");
  EXPECT_EQ(ConvertErrorOf([] { (void)DateToStr(std::nan(""), Plain); }), "'NAN' is not a valid date");
  EXPECT_EQ(ConvertErrorOf([] { (void)TimeToStr(std::numeric_limits<double>::infinity(), Plain); }),
            "'INF' is not a valid time");
  EXPECT_EQ(ConvertErrorOf([] { (void)DateTimeToStr(-1e7, Plain); }),
            "'-10000000' is not a valid date and time");
  EXPECT_EQ(ConvertErrorOf([] { (void)DateTimeToStr(EncodeDate(9999, 12, 31) + 0.9999999999, Plain); }),
            "'2958466' is not a valid date and time"); // the value in 15 digits
  EXPECT_EQ(ConvertErrorOf([] { (void)DateTimeToStr(std::nan(""), Plain); }),
            "'NAN' is not a valid date and time");
}

//===----------------------------------------------------------------------===//
// Text to dates and times
//===----------------------------------------------------------------------===//

TEST(DateParsing, EveryDayOfLeapAndCommonYearsRoundTrips) {
  // Leap years by 4 and 400, common ones by 100, the years around day 0, and both ends.
  for (int Year : {1, 4, 99, 100, 1600, 1700, 1752, 1896, 1899, 1900, 1904, 1999, 2000, 2023, 2024, 2100, 9999}) {
    for (int Month = 1; Month <= 12; ++Month) {
      for (int Day = 1; Day <= 31; ++Day) {
        TDateTime Expected;
        try {
          Expected = EncodeDate(Year, Month, Day);
        } catch (const EConvertError&) {
          TDateTime V = Sentinel;
          EXPECT_FALSE(TryStrToDate(Format("%.4d-%.2d-%.2d", Year, Month, Day), V, Plain));
          EXPECT_EQ(V, Sentinel);
          continue;
        }
        String Text = Format("%.4d-%.2d-%.2d", Year, Month, Day);
        ASSERT_EQ(DateToStr(Expected, Plain), Text);
        TDateTime Back = Sentinel;
        ASSERT_TRUE(TryStrToDate(Text, Back, Plain)) << Text;
        ASSERT_EQ(Back, Expected) << Text;
      }
    }
  }
}

TEST(DateParsing, ConsecutiveDaysAcrossTheWholeRangeRoundTrip) {
  // Every 61st day from 0001-01-01 to 9999-12-31, and each day's successor.
  for (double Day = EncodeDate(1, 1, 1); Day < EncodeDate(9999, 12, 31); Day += 61) {
    for (double D : {Day, Day + 1}) {
      TDateTime Back = Sentinel;
      ASSERT_TRUE(TryStrToDate(DateToStr(D, Plain), Back, Plain)) << D;
      ASSERT_EQ(Back, D);
    }
  }
}

TEST(DateParsing, FieldsOfOneOrMoreDigitsAndTwoDigitYears) {
  auto Read = [](std::string_view Text) {
    TDateTime V = Sentinel;
    EXPECT_TRUE(TryStrToDate(Text, V, Plain)) << Text;
    return V;
  };
  EXPECT_EQ(Read("2024-2-9"), EncodeDate(2024, 2, 9));
  EXPECT_EQ(Read("  2024-02-29 \t"), EncodeDate(2024, 2, 29));
  EXPECT_EQ(Read("24-02-29"), EncodeDate(2024, 2, 29));
  EXPECT_EQ(Read("49-1-1"), EncodeDate(2049, 1, 1));
  EXPECT_EQ(Read("50-1-1"), EncodeDate(1950, 1, 1));
  EXPECT_EQ(Read("99-12-31"), EncodeDate(1999, 12, 31));
  EXPECT_EQ(Read("5-1-1"), EncodeDate(2005, 1, 1));
  EXPECT_EQ(Read("0099-1-1"), EncodeDate(99, 1, 1));
  EXPECT_EQ(Read("2024-0002-0009"), EncodeDate(2024, 2, 9));
}

TEST(DateParsing, RejectsInvalidDatesAndOtherTextAndLeavesTheValue) {
  for (const char* Bad : {"", "   ", "2023-02-29", "1900-02-29", "2024-13-01", "2024-00-10", "2024-04-31",
                          "2024-01-00", "0000-01-01", "10000-01-01", "99999999999-1-1", "2024/02/29",
                          "2024-02-29x", "2024-02", "2024--02-29", "-2024-02-29", "2024-02-29 12:00", "2024 02 29",
                          "x2024-02-29", "2024-+2-29"}) {
    TDateTime V = Sentinel;
    EXPECT_FALSE(TryStrToDate(Bad, V, Plain)) << Bad;
    EXPECT_EQ(V, Sentinel) << Bad;
  }
  TFormatSettings NoYear;
  NoYear.ShortDateFormat = "mm/dd";
  TDateTime V = Sentinel;
  EXPECT_FALSE(TryStrToDate("02-29", V, NoYear)); // a format without a year reads no date
  EXPECT_EQ(V, Sentinel);
}

TEST(DateParsing, TimesMayLeaveOutTheSeconds) {
  auto Read = [](std::string_view Text) {
    TDateTime V = Sentinel;
    EXPECT_TRUE(TryStrToTime(Text, V, Plain)) << Text;
    return V;
  };
  EXPECT_EQ(Read("14:30"), EncodeTime(14, 30, 0, 0));
  EXPECT_EQ(Read("14:30:15"), EncodeTime(14, 30, 15, 0));
  EXPECT_EQ(Read(" 9:5:7 "), EncodeTime(9, 5, 7, 0));
  EXPECT_EQ(Read("0:00"), 0);
  EXPECT_EQ(Read("23:59:59"), EncodeTime(23, 59, 59, 0));
  for (const char* Bad : {"", "24:00", "12:60", "12:00:60", "12", "12:", "12:00:", "12:00:00:00", "12.00", "ab",
                          "-1:00", "12:00 pm", "12 :00"}) {
    TDateTime V = Sentinel;
    EXPECT_FALSE(TryStrToTime(Bad, V, Plain)) << Bad;
    EXPECT_EQ(V, Sentinel) << Bad;
  }
  TFormatSettings Short;
  Short.LongTimeFormat = "hh:nn";
  TDateTime V = Sentinel;
  EXPECT_FALSE(TryStrToTime("12:00:00", V, Short));
  EXPECT_TRUE(TryStrToTime("12:00", V, Short));
  EXPECT_EQ(V, 0.5);
}

TEST(DateParsing, DateAndTimeTogether) {
  auto Read = [](std::string_view Text) {
    TDateTime V = Sentinel;
    EXPECT_TRUE(TryStrToDateTime(Text, V, Plain)) << Text;
    return V;
  };
  TDateTime Leap = EncodeDate(2024, 2, 29);
  EXPECT_EQ(Read("2024-02-29"), Leap);
  EXPECT_EQ(Read(" 2024-02-29 "), Leap);
  EXPECT_EQ(Read("2024-02-29 14:30"), Leap + EncodeTime(14, 30, 0, 0));
  EXPECT_EQ(Read("2024-02-29 \t 14:30:15 "), Leap + EncodeTime(14, 30, 15, 0));
  EXPECT_EQ(Read("1899-12-29 06:00"), -1.25);
  EXPECT_EQ(Read("1899-12-30 06:00"), 0.25);
  for (const char* Bad : {"2024-02-2914:30", "2024-02-29 25:00", "2024-02-29 14:30 x", "2024-02-30 10:00",
                          "2024-02-29 14", "14:30", "2024-02-29T14:30", "2024-02-29 14:30:15:00"}) {
    TDateTime V = Sentinel;
    EXPECT_FALSE(TryStrToDateTime(Bad, V, Plain)) << Bad;
    EXPECT_EQ(V, Sentinel) << Bad;
  }
}

TEST(DateParsing, LiteralsOfTheFormatAreReadAsWritten) {
  TFormatSettings S;
  S.ShortDateFormat = "yyyy. mm. dd."; // a blank in the format reads one or more
  TDateTime Leap = EncodeDate(2024, 2, 29);
  EXPECT_EQ(DateToStr(Leap, S), "2024. 02. 29.");
  TDateTime V = Sentinel;
  EXPECT_TRUE(TryStrToDate("2024.  2. 29.", V, S));
  EXPECT_EQ(V, Leap);
  EXPECT_TRUE(TryStrToDateTime("2024. 02. 29. 14:30", V, S));
  EXPECT_EQ(V, Leap + EncodeTime(14, 30, 0, 0));
  V = Sentinel;
  for (const char* Bad : {"2024.02. 29.", "2024. 02. 29", "2024, 02, 29,", "2024-02-29"}) {
    EXPECT_FALSE(TryStrToDate(Bad, V, S)) << Bad;
    EXPECT_EQ(V, Sentinel) << Bad;
  }
  EXPECT_FALSE(TryStrToDateTime("2024. 02. 29.14:30", V, S)); // a time follows blanks
  EXPECT_EQ(V, Sentinel);
}

TEST(DateParsing, DateAndTimeTextRoundTripsBeforeAndAfterDayZero) {
  for (TDateTime D : {EncodeDate(2024, 2, 29) + EncodeTime(23, 59, 59, 0), EncodeDate(1600, 2, 29),
                      EncodeDate(1850, 6, 15) - EncodeTime(8, 0, 1, 0), EncodeDate(1, 1, 1) - EncodeTime(0, 0, 1, 0),
                      EncodeDate(9999, 12, 31) + EncodeTime(23, 59, 59, 0), 0.75}) {
    String Text = DateTimeToStr(D, Plain);
    TDateTime Back = Sentinel;
    ASSERT_TRUE(TryStrToDateTime(Text, Back, Plain)) << Text;
    EXPECT_DOUBLE_EQ(Back, D) << Text;
  }
}

//===----------------------------------------------------------------------===//
// The global settings
//===----------------------------------------------------------------------===//

TEST(GlobalSettings, AHostMayChangeThemAndEveryReaderSeesIt) {
  TFormatSettings& Global = FormatSettings();
  EXPECT_EQ(&Global, &FormatSettings());
  TFormatSettings Saved = Global;
  {
    auto Restore = Finally([&]() noexcept { Global = std::move(Saved); });
    Global.DecimalSeparator = ',';
    Global.DateSeparator = '.';
    Global.TimeSeparator = '.';
    Global.ShortDateFormat = "dd/mm/yyyy";
    Global.LongTimeFormat = "hh:nn";
    TDateTime D = EncodeDate(2024, 2, 29) + EncodeTime(7, 45, 0, 0);
    EXPECT_EQ(FloatToStrF(0.5, ffGeneral, 15, 0, FormatSettings()), "0,5");
    EXPECT_EQ(DateTimeToStr(D, FormatSettings()), "29.02.2024 07.45");
    TDateTime Back = Sentinel;
    EXPECT_TRUE(TryStrToDateTime("29.2.2024 7.45", Back, FormatSettings()));
    EXPECT_EQ(Back, D);
    EXPECT_FALSE(TryStrToDate("2024-02-29", Back, FormatSettings()));
    double V = Sentinel;
    EXPECT_TRUE(TryStrToFloat("2,5", V, FormatSettings()));
    EXPECT_EQ(V, 2.5);
  }
  EXPECT_EQ(FormatSettings().DecimalSeparator, '.');
  EXPECT_EQ(FormatSettings().DateSeparator, '-');
  EXPECT_EQ(FormatSettings().TimeSeparator, ':');
  EXPECT_EQ(FormatSettings().ShortDateFormat, "yyyy/mm/dd");
  EXPECT_EQ(FormatSettings().LongTimeFormat, "hh:nn:ss");
}

TEST(GlobalSettings, BooleanIdentsAndMessages) {
  EXPECT_STREQ(BooleanIdents[false], "False");
  EXPECT_STREQ(BooleanIdents[true], "True");
  EXPECT_EQ(Exception(SInvalidFloat, "1,5").Message(), "'1,5' is not a valid floating point value");
  EXPECT_EQ(Exception(SInvalidDate, "x").Message(), "'x' is not a valid date");
  EXPECT_EQ(Exception(SInvalidTime, "x").Message(), "'x' is not a valid time");
  EXPECT_EQ(Exception(SInvalidDateTime, "x").Message(), "'x' is not a valid date and time");
  EXPECT_EQ(Exception(SOutOfRange, 0, 9).Message(), "Value must be between 0 and 9");
  EXPECT_EQ(Exception(SOutOfRange, 0LL, 4294967295LL).Message(), "Value must be between 0 and 4294967295");
}
