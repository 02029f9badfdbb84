//===- tests/frameworks/kiln/design/KilnFontEditorsTest.cpp - Fonts, faces, character sets ===//
//
// The font editor and its dialog, the face editor with the screen's fonts drawn
// plainly or each in its own face, character sets by name or number, and input
// method names.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnEditorsFixture.h"

#include "platform/ScopeGuard.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

using Texts = std::vector<String>;

struct KilnFontEditorsTest : KilnEditorsFixture {
  void SetUp() override {
    KilnEditorsFixture::SetUp();
    SavedFonts = ScreenFonts();
    ScreenFonts() = {"Sans Serif", "Serif", "Monospace"};
  }
  void TearDown() override {
    ScreenFonts() = SavedFonts;
    ScreenImes().clear();
    KilnEditorsFixture::TearDown();
  }
  /// The editor of the font's face, nested under the button's font.
  IPtr<IProperty> FaceOf(TButton* Button) {
    IPtr<IProperty> Face;
    PropertyOf({Button}, "Font")->GetProperties([&](const IPtr<IProperty>& P) {
      if (P->GetName() == "Name") Face = P;
    });
    return Face;
  }
  std::vector<String> SavedFonts;
};

TEST_F(KilnFontEditorsTest, TheFontDialogOpensOnTheFontAndItsChoiceIsCopiedToEveryButton) {
  auto* One = Make<TButton>();
  auto* Two = Make<TButton>();
  IPtr<IProperty> P = PropertyOf({One, Two}, "Font");
  ASSERT_TRUE(EditorOf<TFontProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paSubProperties, paDialog, paReadOnly}));

  DialogScript().Answer(mrOk, {"Serif", "12", "clMaroon"});
  P->Edit();
  const TShownDialog& Shown = DialogScript().Shown().at(0);
  EXPECT_EQ(Shown.Kind, "FontDialog");
  EXPECT_EQ(Shown.Prompts, (Texts{"HelpContext=25000", "Options=[fdForceFontExist,fdShowHelp]"}));
  EXPECT_EQ(Shown.Values, (Texts{"Sans Serif", "9", "clWindowText"}));
  for (TButton* B : {One, Two}) {
    EXPECT_EQ(B->Font()->Name(), "Serif");
    EXPECT_EQ(B->Font()->Size(), 12);
    EXPECT_EQ(B->Font()->Color(), clMaroon);
  }
  EXPECT_NE(One->Font(), Two->Font()) << "each button copies the font into its own";

  // A face the screen does not have is refused, and no font changes.
  DialogScript().Answer(mrOk, {"Comic Relief", "10"});
  EXPECT_EQ(ErrorOf<EInvalidOperation>([&] { P->Edit(); }), "Font Comic Relief does not exist");
  EXPECT_EQ(One->Font()->Name(), "Serif");
  EXPECT_EQ(One->Font()->Size(), 12);
  DialogScript().Answer(mrCancel);
  P->Edit();
  EXPECT_EQ(Two->Font()->Size(), 12);
}

TEST_F(KilnFontEditorsTest, FacesComeFromTheScreenAndAreDrawnInTheirOwnFaceOnRequest) {
  IPtr<IProperty> Face = FaceOf(Make<TButton>());
  ASSERT_TRUE(EditorOf<TFontNameProperty>(Face));
  EXPECT_EQ(Face->GetAttributes(), (TPropertyAttributes{paMultiSelect, paValueList, paSortList, paRevertable}));
  EXPECT_EQ(ValuesOf(Face), (Texts{"Sans Serif", "Serif", "Monospace"}));
  Face->SetValue("Monospace");
  EXPECT_EQ(Face->GetValue(), "Monospace");

  auto List = QueryAs<ICustomPropertyListDrawing>(Face);
  int Width = 40, Height = 16;
  List->ListDrawValue("Serif", Canvas.Get(), Rect(0, 0, 100, 16), false);
  List->ListMeasureWidth("Serif", Canvas.Get(), Width);
  List->ListMeasureHeight("Serif", Canvas.Get(), Height);
  EXPECT_EQ(Drawn(), (Texts{"FillRect(0,0,100,16)", "TextRect(9,0,100,16,9,2,\"Serif\")"}));
  EXPECT_EQ(Width, 40);
  EXPECT_EQ(Height, 16);

  FontNamePropertyDisplayFontNames = true; // read by each drawing
  List->ListDrawValue("Serif", Canvas.Get(), Rect(0, 0, 100, 16), false);
  List->ListMeasureWidth("Serif", Canvas.Get(), Width);
  List->ListMeasureHeight("Serif", Canvas.Get(), Height);
  EXPECT_EQ(Drawn(), (Texts{"Font Serif", "TextRect(0,0,100,16,10,1,\"Serif\")"}));
  EXPECT_EQ(Canvas->Font()->Name(), "Sans Serif") << "the canvas's face is put back";
  EXPECT_EQ(Width, 34) << "five characters of 6 pixels, and 4";
  EXPECT_EQ(Height, 14) << "a line of 12 pixels, and 2";
}

TEST_F(KilnFontEditorsTest, CharacterSetsShowTheirNamesOrNumbers) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Charset");
  ASSERT_TRUE(EditorOf<TFontCharsetProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paSortList, paValueList}));
  EXPECT_EQ(P->GetValue(), "DEFAULT_CHARSET");
  P->SetValue("greek_charset");
  EXPECT_EQ(G->FCharset, GREEK_CHARSET);
  EXPECT_EQ(P->GetValue(), "GREEK_CHARSET");
  P->SetValue("204");
  EXPECT_EQ(P->GetValue(), "RUSSIAN_CHARSET");
  P->SetValue("100");
  EXPECT_EQ(P->GetValue(), "100") << "a character set without a name shows its number";
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("KLINGON_CHARSET"); }),
            "'KLINGON_CHARSET' is not a valid integer value");
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("256"); }), "Value must be between 0 and 255");
  EXPECT_EQ(G->FCharset, 100);
  Texts Values = ValuesOf(P);
  ASSERT_EQ(Values.size(), 19u);
  EXPECT_EQ(Values.front(), "ANSI_CHARSET");
  EXPECT_EQ(Values.back(), "OEM_CHARSET");
}

TEST_F(KilnFontEditorsTest, InputMethodsComeFromTheScreen) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Ime");
  ASSERT_TRUE(EditorOf<TImeNameProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paValueList, paSortList, paMultiSelect}));
  EXPECT_EQ(ValuesOf(P), Texts{});
  ScreenImes() = {"Pinyin", "Hangul"};
  EXPECT_EQ(ValuesOf(P), (Texts{"Pinyin", "Hangul"}));
  P->SetValue("Hangul");
  EXPECT_EQ(G->FIme, "Hangul");
}

} // namespace
