//===- tests/platform/SystemTest.cpp - Run-time library ------------------===//
#include "platform/Variants.h"

#include <gtest/gtest.h>

using namespace formkit;

TEST(Format, ConversionsWidthsAndErrors) {
  EXPECT_EQ(Format("%s has %d items", "List", 3), "List has 3 items");
  EXPECT_EQ(Format("[%5s|%-5s|%.2s]", "ab", "cd", "efgh"), "[   ab|cd   |ef]");
  EXPECT_EQ(Format("%x %.4x %u", 255, 10, 7u), "FF 000A 7");
  EXPECT_EQ(Format("%.3d %d", -5, -2147483647 - 1), "-005 -2147483648");
  EXPECT_EQ(Format("%.2f %e %n", 2.345, 1500.0, 1234567.891), "2.35 1.50E+003 1,234,567.89");
  EXPECT_EQ(Format("%*d|100%%", 4, 7), "   7|100%");
  for (auto Bad : {"%d", "%q", "%"}) {
    try {
      Format(Bad);
      FAIL() << Bad;
    } catch (const EConvertError& E) {
      EXPECT_EQ(E.Message(), String("Format '") + Bad + "' invalid or incompatible with argument");
    }
  }
  EXPECT_THROW(Format("%d", "text"), EConvertError);
  EXPECT_THROW(Format("%s", 3), EConvertError);
}

namespace {
FK_RESOURCESTRING(SGreeting, "Hello %s");
}

TEST(Format, ResourceStringsCanBeReplacedByTheHost) {
  EXPECT_EQ(Exception(SGreeting, "you").Message(), "Hello you");
  SetResStringOverride("SGreeting", "Hallo %s");
  EXPECT_EQ(Exception(SGreeting, "du").Message(), "Hallo du");
  ClearResStringOverrides();
  EXPECT_EQ(LoadResString(SGreeting), "Hello %s");
  EXPECT_STREQ(EAbort("x").ClassName(), "EAbort");
  EXPECT_THROW(Abort(), EAbort);
}

TEST(Numbers, MulDivRoundsHalfAwayFromZero) {
  EXPECT_EQ(MulDiv(5, 1, 2), 3);
  EXPECT_EQ(MulDiv(-5, 1, 2), -3);
  EXPECT_EQ(MulDiv(5, -1, 2), -3);
  EXPECT_EQ(MulDiv(7, 1, 3), 2);
  EXPECT_EQ(MulDiv(100, 144, 96), 150);
  EXPECT_EQ(MulDiv(2000000000, 3, 4), 1500000000); // the product needs 64 bits
  EXPECT_EQ(MulDiv(1, 1, 0), -1);
  EXPECT_EQ(StrToInt("$FF"), 255);
  EXPECT_EQ(StrToInt64(" -42 "), -42);
  try {
    StrToInt("12a");
    FAIL();
  } catch (const EConvertError& E) {
    EXPECT_EQ(E.Message(), "'12a' is not a valid integer value");
  }
  EXPECT_THROW(StrToInt("99999999999"), EConvertError);
  EXPECT_THROW(StrToInt64("9223372036854775808"), EConvertError);
  EXPECT_EQ(StrToInt64("-9223372036854775808"), INT64_MIN);
}

TEST(Text, NamesCompareWithoutRegardToAsciiCaseOnly) {
  EXPECT_EQ(CompareText("Button1", "BUTTON1"), 0);
  EXPECT_LT(CompareText("abc", "ABD"), 0);
  EXPECT_LT(CompareText("ab", "abc"), 0);
  EXPECT_NE(CompareText("\xc3\xa9", "\xc3\x89"), 0); // no folding beyond ASCII
  EXPECT_TRUE(AnsiStartsText("tform", "TForm1"));
  EXPECT_TRUE(IsValidIdent("_Form1"));
  EXPECT_FALSE(IsValidIdent("Form 1"));
  EXPECT_FALSE(IsValidIdent(""));
  EXPECT_EQ(ChangeFileExt("dir.v2/unit1.kfm", ".txt"), "dir.v2/unit1.txt");
  EXPECT_EQ(ChangeFileExt("dir.v2/unit1", ".kfm"), "dir.v2/unit1.kfm");
  EXPECT_EQ(ExtractFileExt("a/b.c/d"), "");
  EXPECT_EQ(ExtractFileName("a/b/c.kfm"), "c.kfm");
  EXPECT_EQ(Trim("\t x \r\n"), "x");
}

TEST(Text, WideConversionsRoundTripAndReplaceMalformedInput) {
  String S = "a\xc3\xa9\xe2\x82\xac\xf0\x9f\x98\x80";
  WideString W = Utf8ToUtf16(S);
  EXPECT_EQ(W.size(), 5u); // the emoji is a surrogate pair
  EXPECT_EQ(Utf16ToUtf8(W), S);
  EXPECT_EQ(Utf8ToUtf16("\xff"), u"\uFFFD");
  EXPECT_EQ(Utf8ToUtf16("\xe2\x82"), u"\uFFFD\uFFFD"); // truncated sequence
  EXPECT_EQ(Utf8ToUtf16("\xc0\xaf"), u"\uFFFD\uFFFD"); // overlong form
  EXPECT_EQ(Utf16ToUtf8(u"\xD800x"), "\xef\xbf\xbdx");
}

TEST(Dates, EncodingAndItsErrors) {
  EXPECT_EQ(EncodeDate(1899, 12, 30), 0);
  EXPECT_EQ(EncodeDate(2000, 1, 1), 36526);
  EXPECT_DOUBLE_EQ(EncodeTime(12, 0, 0, 0), 0.5);
  try {
    EncodeDate(2023, 2, 29);
    FAIL();
  } catch (const EConvertError& E) {
    EXPECT_EQ(E.Message(), "Invalid argument to date encode");
  }
  EXPECT_NO_THROW(EncodeDate(2024, 2, 29));
  EXPECT_THROW(EncodeTime(24, 0, 0, 0), EConvertError);
  EXPECT_GT(Now(), EncodeDate(2020, 1, 1));
}

TEST(Geometry, RightAndBottomAreExclusive) {
  TRect R = Bounds(10, 20, 30, 40);
  EXPECT_EQ(R, Rect(10, 20, 40, 60));
  EXPECT_TRUE(R.Contains({10, 20}));
  EXPECT_FALSE(R.Contains({40, 30}));
  EXPECT_FALSE(R.Contains({15, 60}));
  TRect Out;
  EXPECT_FALSE(IntersectRect(Out, R, Rect(40, 20, 50, 30))); // touching edges do not overlap
  EXPECT_TRUE(Out.IsEmpty());
  EXPECT_TRUE(IntersectRect(Out, R, Rect(35, 55, 100, 100)));
  EXPECT_EQ(Out, Rect(35, 55, 40, 60));
  EXPECT_EQ(UnionRect(R, TRect{}), R);
  EXPECT_EQ(UnionRect(R, Rect(0, 0, 5, 5)), Rect(0, 0, 40, 60));
}

TEST(Variants, ConversionsAndTheirErrors) {
  EXPECT_EQ(TVariant().VarType(), varEmpty);
  EXPECT_EQ(TVariant(7).AsString(), "7");
  EXPECT_EQ(TVariant(String("12")).AsInteger(), 12);
  EXPECT_EQ(TVariant(true).AsInteger(), -1);
  EXPECT_EQ(TVariant(String("true")).AsBoolean(), true);
  EXPECT_EQ(TVariant(2.5).AsString(), "2.5");
  EXPECT_EQ(TVariant(std::int64_t(1) << 40).VarType(), varInt64);
  EXPECT_TRUE(TVariant(3) == TVariant(3));
  EXPECT_FALSE(TVariant(3) == TVariant(std::int64_t(3)));
  try {
    TVariant(String("abc")).AsInteger();
    FAIL();
  } catch (const EVariantTypeCastError& E) {
    EXPECT_EQ(E.Message(), "Could not convert variant of type (UnicodeString) into type (Int64)");
  }
  EXPECT_THROW(TVariant::Null().AsBoolean(), EVariantTypeCastError);
  EXPECT_THROW(TVariant(std::int64_t(1) << 40).AsInteger(), EVariantTypeCastError);
  EXPECT_EQ(TVariant().AsInterface(), nullptr);
}
