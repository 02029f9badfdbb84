//===- tests/editors/ScalarEditorsTest.cpp - The text form of each value --===//
#include "tests/editors/EditorSamples.h"

#include "platform/FormatSettings.h"

#include <cmath>

namespace formkit::samples {
namespace {

using ScalarEditorsTest = EditorFixture;

TEST_F(ScalarEditorsTest, IntegersShowDecimalAndRefuseTextsOutOfTheirRange) {
  TGadget* G = Make<TGadget>("Gadget1");
  IPtr<IProperty> Count = EditorOf({G}, "Count");
  G->FCount = -5;
  EXPECT_EQ(Count->GetValue(), "-5");
  Count->SetValue("2147483647");
  EXPECT_EQ(G->FCount, 2147483647);
  ExpectRejected([&] { Count->SetValue("2147483648"); }, "Value must be between -2147483648 and 2147483647");
  ExpectRejected([&] { Count->SetValue("12abc"); }, "'12abc' is not a valid integer value");
  EXPECT_EQ(G->FCount, 2147483647);
  EXPECT_EQ(Count->GetEditLimit(), 63);

  IPtr<IProperty> Digit = EditorOf({G}, "Digit");
  ExpectRejected([&] { Digit->SetValue("10"); }, "Value must be between 0 and 9");
  Digit->SetValue("$9");
  EXPECT_EQ(G->FDigit, 9);

  // The full unsigned range: every bit set is accepted and shown unsigned.
  IPtr<IProperty> Mask = EditorOf({G}, "Mask");
  Mask->SetValue("4294967295");
  EXPECT_EQ(G->FMask, 0xFFFFFFFFu);
  EXPECT_EQ(Mask->GetValue(), "4294967295");
  ExpectRejected([&] { Mask->SetValue("-1"); }, "Value must be between 0 and 4294967295");
  ExpectRejected([&] { Mask->SetValue("4294967296"); }, "Value must be between 0 and 4294967295");
}

TEST_F(ScalarEditorsTest, CharactersShowThemselvesOnlyFrom33To127) {
  TGadget* G = Make<TGadget>("Gadget1");
  IPtr<IProperty> Letter = EditorOf({G}, "Letter");
  auto Shows = [&](int Code) {
    G->FLetter = static_cast<char>(Code);
    return Letter->GetValue();
  };
  EXPECT_EQ(Shows(32), "#32");
  EXPECT_EQ(Shows(33), "!");
  EXPECT_EQ(Shows(127), "\x7f");
  EXPECT_EQ(Shows(0), "#0");
  EXPECT_EQ(Shows(200), "#200");
  auto Stores = [&](const String& Text) {
    Letter->SetValue(Text);
    return static_cast<int>(static_cast<unsigned char>(G->FLetter));
  };
  EXPECT_EQ(Stores(""), 0);
  EXPECT_EQ(Stores("A"), 65);
  EXPECT_EQ(Stores("#66"), 66);
  EXPECT_EQ(Stores("#"), 35);
  ExpectRejected([&] { Letter->SetValue("AB"); }, "Invalid property value");
  ExpectRejected([&] { Letter->SetValue("#x"); }, "Invalid property value");
  ExpectRejected([&] { Letter->SetValue("#256"); }, "Value must be between 0 and 255");
  EXPECT_EQ(Stores("\xc3\xa9"), 233); // one character, whatever its bytes
  ExpectRejected([&] { Letter->SetValue("\xe2\x82\xac"); }, "Value must be between 0 and 255");
  EXPECT_EQ(static_cast<unsigned char>(G->FLetter), 233);

  // A wide character: the plain read shows non-ASCII as "#n", the wide read as itself.
  IPtr<IProperty> Glyph = EditorOf({G}, "Glyph");
  IPtr<IWideProperty> Wide = QueryAs<IWideProperty>(Glyph);
  ASSERT_TRUE(Wide);
  G->FGlyph = u'\u00e9';
  EXPECT_EQ(Glyph->GetValue(), "#233");
  EXPECT_EQ(Wide->GetValueW(), u"\u00e9");
  G->FGlyph = u' ';
  EXPECT_EQ(Wide->GetValueW(), u"#32");
  Wide->SetValueW(u"\u20ac");
  EXPECT_EQ(G->FGlyph, u'\u20ac');
  Glyph->SetValue("#65");
  EXPECT_EQ(G->FGlyph, u'A');
}

TEST_F(ScalarEditorsTest, EnumerationsShowNamesAndStepThroughTheSortedValues) {
  TGadget* G = Make<TGadget>("Gadget1");
  IPtr<IProperty> Level = EditorOf({G}, "Level");
  G->FLevel = static_cast<TLevel>(7); // beyond the last name
  EXPECT_EQ(Level->GetValue(), "lvTop");
  std::vector<String> Values;
  Level->GetValues([&](const String& S) { Values.push_back(S); });
  EXPECT_EQ(Values, (std::vector<String>{"lvLow", "lvMid", "lvHigh", "lvTop"}));
  EXPECT_EQ(Level->GetAttributes(), (TPropertyAttributes{paValueList, paMultiSelect, paSortList, paRevertable}));
  Level->SetValue("LVMID");
  EXPECT_EQ(G->FLevel, lvMid);
  ExpectRejected([&] { Level->SetValue("lvNone"); }, "Invalid property value");
  // Edit steps through the values sorted by name, wrapping at the end.
  Level->Edit();
  EXPECT_EQ(G->FLevel, lvTop);
  Level->Edit();
  EXPECT_EQ(G->FLevel, lvHigh);

  IPtr<IProperty> Flag = EditorOf({G}, "Flag");
  Values.clear();
  Flag->GetValues([&](const String& S) { Values.push_back(S); });
  EXPECT_EQ(Values, (std::vector<String>{"False", "True"}));
  Flag->Edit();
  EXPECT_TRUE(G->FFlag);
  EXPECT_EQ(Flag->GetValue(), "True");
}

TEST_F(ScalarEditorsTest, SetsShowTheirElementsAndAreEditedOneElementAtATime) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  IPtr<IProperty> Tints = EditorOf({G}, "Tints");
  EXPECT_EQ(Tints->GetValue(), "[tiGreen]");
  G->FTints = TTints{tiRed, tiBlue};
  EXPECT_EQ(Tints->GetValue(), "[tiRed,tiBlue]");
  G->FTints = TTints{};
  EXPECT_EQ(Tints->GetValue(), "[]");
  Tints->SetValue("[tiRed]"); // ignored: sets are edited through their elements
  EXPECT_TRUE(G->FTints.Empty());
  EXPECT_EQ(Tints->GetAttributes(), (TPropertyAttributes{paSubProperties, paMultiSelect, paReadOnly, paRevertable}));

  G->FTints = TTints{tiGreen};
  H->FTints = TTints{tiRed, tiGreen};
  IPtr<IProperty> Both = EditorOf({G, H}, "Tints");
  std::vector<IPtr<IProperty>> Elements;
  Both->GetProperties([&](const IPtr<IProperty>& P) { Elements.push_back(P); });
  ASSERT_EQ(NamesOf(Elements), (std::vector<String>{"tiRed", "tiGreen", "tiBlue"}));
  EXPECT_EQ(Elements[0]->GetValue(), "False");
  EXPECT_FALSE(Elements[0]->AllEqual()); // G lacks red, H has it
  EXPECT_TRUE(Elements[1]->AllEqual());
  EXPECT_EQ(Elements[1]->GetValue(), "True");
  EXPECT_EQ(Elements[2]->GetAttributes(), (TPropertyAttributes{paValueList, paMultiSelect, paSortList}));
  // Every object gets the first object's set with this bit changed.
  Elements[2]->SetValue("TRUE");
  EXPECT_EQ(G->FTints, (TTints{tiGreen, tiBlue}));
  EXPECT_EQ(H->FTints, (TTints{tiGreen, tiBlue}));
  Elements[1]->SetValue("yes"); // anything but "True" clears
  EXPECT_EQ(G->FTints, (TTints{tiBlue}));
  // The nested editors keep the pairs alive after the set editor is let go.
  Both = nullptr;
  EXPECT_EQ(Elements[2]->GetValue(), "True");
}

TEST_F(ScalarEditorsTest, FloatsShowInTheGlobalFormatAndCompareExactly) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  IPtr<IProperty> Scale = EditorOf({G}, "Scale");
  G->FScale = 0.1;
  EXPECT_EQ(Scale->GetValue(), "0.1");
  G->FScale = 1e15;
  EXPECT_EQ(Scale->GetValue(), "1E15");
  G->FScale = -1.0 / 3;
  EXPECT_EQ(Scale->GetValue(), "-0.333333333333333");
  G->FRatio = 0.1f; // single precision shows 7 digits
  EXPECT_EQ(EditorOf({G}, "Ratio")->GetValue(), "0.1");
  Scale->SetValue("2.5E3");
  EXPECT_EQ(G->FScale, 2500);
  ExpectRejected([&] { Scale->SetValue("2,5"); }, "'2,5' is not a valid floating point value");
  EXPECT_EQ(Scale->GetEditLimit(), 2047);

  TFormatSettings Saved = FormatSettings();
  auto Restore = Finally([&]() noexcept { FormatSettings() = Saved; });
  FormatSettings().DecimalSeparator = ',';
  Scale->SetValue("0,5");
  EXPECT_EQ(G->FScale, 0.5);
  EXPECT_EQ(Scale->GetValue(), "0,5");

  // Values that print alike but differ in the last bit are not equal.
  G->FScale = 0.1;
  H->FScale = std::nextafter(0.1, 1.0);
  IPtr<IProperty> Both = EditorOf({G, H}, "Scale");
  EXPECT_EQ(Both->GetValue(), EditorOf({H}, "Scale")->GetValue());
  EXPECT_FALSE(Both->AllEqual());
}

TEST_F(ScalarEditorsTest, TextsLargeNumbersNamesAndObjects) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  IPtr<IProperty> Big = EditorOf({G}, "Big");
  Big->SetValue("-9223372036854775808");
  EXPECT_EQ(G->FBig, INT64_MIN);
  EXPECT_EQ(Big->GetValue(), "-9223372036854775808");
  ExpectRejected([&] { Big->SetValue("9223372036854775808"); }, "'9223372036854775808' is not a valid integer value");

  G->FCaption = "Go";
  H->FCaption = "go";
  IPtr<IProperty> Caption = EditorOf({G, H}, "Caption");
  EXPECT_FALSE(Caption->AllEqual()); // case counts
  EXPECT_EQ(Caption->GetEditLimit(), 2047);
  Caption->SetValue("Stop");
  EXPECT_EQ(H->FCaption, "Stop");
  EXPECT_TRUE(Caption->AllEqual());

  // Only the wide form stores a wide string.
  IPtr<IProperty> Title = EditorOf({G}, "Title");
  Title->SetValue("Ignored");
  EXPECT_TRUE(G->FTitle.empty());
  QueryAs<IWideProperty>(Title)->SetValueW(u"Caf\u00e9");
  EXPECT_EQ(Title->GetValue(), "Caf\xc3\xa9");
  EXPECT_EQ(QueryAs<IWideProperty10>(Title)->GetNameW(), u"Title");

  IPtr<IProperty> Name = EditorOf({G}, "Name");
  EXPECT_EQ(Name->GetAttributes(), TPropertyAttributes{paNotNestable});
  EXPECT_EQ(Name->GetEditLimit(), 63);
  EXPECT_EQ(Name->GetValue(), "Gadget1");

  IPtr<IProperty> Style = EditorOf({G, H}, "Style");
  EXPECT_EQ(Style->GetValue(), "(TGadgetStyle)");
  EXPECT_EQ(Style->GetAttributes(), (TPropertyAttributes{paSubProperties, paMultiSelect, paReadOnly}));
  std::vector<IPtr<IProperty>> Nested;
  Style->GetProperties([&](const IPtr<IProperty>& P) { Nested.push_back(P); });
  ASSERT_EQ(NamesOf(Nested), (std::vector<String>{"Face", "Size"}));
  Nested[1]->SetValue("12");
  EXPECT_EQ(G->FStyle->FSize, 12);
  EXPECT_EQ(H->FStyle->FSize, 12);
}

TEST_F(ScalarEditorsTest, DatesShowEmptyForZeroAndParseInTheGlobalFormat) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  IPtr<IProperty> Stamp = EditorOf({G}, "Stamp");
  EXPECT_EQ(Stamp->GetValue(), "");
  Stamp->SetValue("2024-02-29 13:45:00");
  EXPECT_EQ(G->FStamp, EncodeDate(2024, 2, 29) + EncodeTime(13, 45, 0, 0));
  EXPECT_EQ(Stamp->GetValue(), "2024-02-29 13:45:00");
  ExpectRejected([&] { Stamp->SetValue("2023-02-29"); }, "'2023-02-29' is not a valid date and time");
  Stamp->SetValue("");
  EXPECT_EQ(G->FStamp, 0);
  EXPECT_EQ(Stamp->GetAttributes(), (TPropertyAttributes{paMultiSelect, paRevertable}));
  // Date editors do not compare: a multi-selection shows nothing even when all agree.
  IPtr<IProperty> Both = EditorOf({G, H}, "Stamp");
  EXPECT_FALSE(Both->AllEqual());

  // The date and the time editors, as a framework package would register them.
  RegisterPropertyEditor(TypeInfo_TDateTime(), TGadget::StaticClass(), "Stamp", TDateProperty::StaticClass());
  IPtr<IProperty> Date = EditorOf({G}, "Stamp");
  Date->SetValue("1899-12-29");
  EXPECT_EQ(G->FStamp, -1);
  EXPECT_EQ(Date->GetValue(), "1899-12-29");
  ExpectRejected([&] { Date->SetValue("yesterday"); }, "'yesterday' is not a valid date");
  RegisterPropertyEditor(TypeInfo_TDateTime(), TGadget::StaticClass(), "Stamp", TTimeProperty::StaticClass());
  IPtr<IProperty> Time = EditorOf({G}, "Stamp");
  Time->SetValue("06:30");
  EXPECT_EQ(Time->GetValue(), "06:30:00");
  ExpectRejected([&] { Time->SetValue("25:00"); }, "'25:00' is not a valid time");
}

} // namespace
} // namespace formkit::samples
