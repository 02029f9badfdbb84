//===- tests/frameworks/kiln/design/KilnColorEditorsTest.cpp - Colours, brushes, pens ===//
//
// The colour editor's texts both ways, its box in the inspector's row and list,
// the colour dialog with the custom colours kept in the registry; the samples of
// the brush and pen style editors.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnEditorsFixture.h"

#include "platform/Registry.h"
#include "platform/ScopeGuard.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

using Texts = std::vector<String>;

struct KilnColorEditorsTest : KilnEditorsFixture {};

TEST_F(KilnColorEditorsTest, ColoursShowTheirNamesAndTakeNamesOrNumbers) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Color");
  ASSERT_TRUE(EditorOf<TColorProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paDialog, paValueList, paRevertable}));
  EXPECT_EQ(P->GetValue(), "clRed");

  P->SetValue("clyellow"); // a name in another case
  EXPECT_EQ(G->FColor, clYellow);
  EXPECT_EQ(P->GetValue(), "clYellow");
  P->SetValue("8421504"); // a number that has a name shows the name
  EXPECT_EQ(P->GetValue(), "clGray");
  P->SetValue("1193046");
  EXPECT_EQ(P->GetValue(), "$00123456");

  // Neither a name nor a decimal number: the integer parse's message, the value kept.
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("clNoSuchColour"); }),
            "'clNoSuchColour' is not a valid integer value");
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("$00XYZ0"); }), "'$00XYZ0' is not a valid integer value");
  EXPECT_EQ(G->FColor, 0x123456);
  P->SetValue("$00FF00"); // a hexadecimal number goes through the integer parse
  EXPECT_EQ(P->GetValue(), "clLime");

  Texts Names;
  GetColorValues([&](const String& N) { Names.push_back(N); });
  EXPECT_EQ(ValuesOf(P), Names);
  EXPECT_EQ(ValuesOf(P).front(), "clBlack");
}

TEST_F(KilnColorEditorsTest, AColourIsDrawnAsABoxInTheRowAndBesideItsNameInTheList) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Color");
  auto Drawing = QueryAs<ICustomPropertyDrawing80>(P);
  auto List = QueryAs<ICustomPropertyListDrawing>(P);
  ASSERT_TRUE(Drawing && List);

  // The row: the inspector learns where the box goes, a square at the left.
  EXPECT_EQ(Drawing->PropDrawNameRect(Rect(0, 0, 100, 16)), Rect(0, 0, 100, 16));
  EXPECT_EQ(Drawing->PropDrawValueRect(Rect(100, 0, 300, 16)), Rect(100, 0, 116, 16));
  Drawing->PropDrawValue(Canvas.Get(), Rect(100, 0, 116, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"FillRect(100,0,116,16)", "Brush clRed bsSolid", "FillRect(102,2,114,14)",
                            "Brush clWindowText bsSolid", "FrameRect(102,2,114,14)"}));
  EXPECT_EQ(Canvas->Brush()->Color(), clWhite) << "the canvas is given back as it was";
  Drawing->PropDrawValue(Canvas.Get(), Rect(100, 0, 116, 16), true);
  EXPECT_EQ(Drawn()[3], "Brush clHighlightText bsSolid") << "a selected row frames in the highlight text colour";
  Drawing->PropDrawName(Canvas.Get(), Rect(0, 0, 100, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"TextRect(2,0,100,16,2,2,\"Color\")"}));

  // The list: inset by the drawing offset, the box, then the name.
  List->ListDrawValue("clLime", Canvas.Get(), Rect(0, 0, 200, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"FillRect(8,0,200,16)", "Brush clLime bsSolid", "FillRect(10,2,22,14)",
                            "Brush clWindowText bsSolid", "FrameRect(10,2,22,14)", "Brush clWhite bsSolid",
                            "FillRect(28,0,200,16)", "TextRect(29,0,200,16,29,2,\"clLime\")"}));
  PropertyDrawingOffset = 0; // read by each drawing
  List->ListDrawValue("$00123456", Canvas.Get(), Rect(0, 0, 200, 16), false);
  Texts Shifted = Drawn();
  EXPECT_EQ(Shifted[0], "FillRect(0,0,200,16)");
  EXPECT_EQ(Shifted[1], "Brush $00123456 bsSolid");
  int Width = 50, Height = 16;
  List->ListMeasureWidth("clLime", Canvas.Get(), Width);
  List->ListMeasureHeight("clLime", Canvas.Get(), Height);
  EXPECT_EQ(Width, 62) << "the width of the box, a text height, is added";
  EXPECT_EQ(Height, 16);

  // Objects that disagree show no box, only the (empty) text.
  TValueGadget* Other = MakeGadget();
  Other->FColor = clBlue;
  auto Mixed = QueryAs<ICustomPropertyDrawing80>(PropertyOf({G, Other}, "Color"));
  Mixed->PropDrawValue(Canvas.Get(), Rect(100, 0, 116, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"TextRect(101,0,116,16,101,2,\"\")"}));
}

TEST_F(KilnColorEditorsTest, TheColourDialogKeepsItsCustomColoursInTheRegistry) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Color");
  auto Cleanup = Finally([]() noexcept {
    TRegistry Reg;
    (void)Reg.DeleteKey("\\Software\\FormkitTest");
    BaseRegistryKey.clear();
  });
  {
    TRegistry Reg;
    ASSERT_TRUE(Reg.OpenKey("\\Software\\FormkitTest\\Colors\\Custom Colors", true));
    Reg.WriteString("ColorA", "FFFFFF");
  }
  BaseRegistryKey = "Software\\FormkitTest\\Colors";
  DialogScript().Answer(mrOk, {"clLime", "ColorA=0000FF", "ColorB=00FF00", "a line without a value"});
  P->Edit();
  EXPECT_EQ(G->FColor, clLime);
  ASSERT_EQ(DialogScript().Shown().size(), 1u);
  const TShownDialog& Shown = DialogScript().Shown()[0];
  EXPECT_EQ(Shown.Kind, "ColorDialog");
  EXPECT_EQ(Shown.Prompts, (Texts{"HelpContext=25010", "Options=[cdShowHelp]"}));
  EXPECT_EQ(Shown.Values, (Texts{"clRed", "ColorA=FFFFFF"})) << "the present colour and the kept custom colours";

  TRegistry Reg;
  ASSERT_TRUE(Reg.OpenKeyReadOnly("\\Software\\FormkitTest\\Colors\\Custom Colors"));
  TStringList Names;
  Reg.GetValueNames(&Names);
  EXPECT_EQ(Names.Count(), 2) << "the line without \"=\" is skipped";
  EXPECT_EQ(Reg.ReadString("ColorA"), "0000FF");
  EXPECT_EQ(Reg.ReadString("ColorB"), "00FF00");

  // The next edit starts from them; a cancelled dialog changes no colour.
  DialogScript().Answer(mrCancel);
  P->Edit();
  EXPECT_EQ(DialogScript().Shown()[1].Values, (Texts{"clLime", "ColorA=0000FF", "ColorB=00FF00"}));
  EXPECT_EQ(G->FColor, clLime);

  // A key that cannot hold them: the colour is taken, then the write of the custom
  // colours raises.
  BaseRegistryKey = "Software\\\\Broken";
  DialogScript().Answer(mrOk, {"clNavy", "ColorA=808080"});
  EXPECT_EQ(ErrorOf<ERegistryException>([&] { P->Edit(); }), "No registry key is open to hold 'ColorA'");
  EXPECT_EQ(DialogScript().Shown()[2].Values, (Texts{"clLime"})) << "what cannot be read is left out";
  EXPECT_EQ(G->FColor, clNavy);
}

TEST_F(KilnColorEditorsTest, WithoutARegistryKeyTheColourDialogTouchesNoRegistry) {
  TValueGadget* G = MakeGadget();
  const String Before = RegistryStore().SaveToText();
  DialogScript().Answer(mrOk, {"clBlue", "ColorA=123456"});
  PropertyOf({G}, "Color")->Edit();
  EXPECT_EQ(G->FColor, clBlue);
  EXPECT_EQ(DialogScript().Shown()[0].Values, (Texts{"clRed"}));
  EXPECT_EQ(RegistryStore().SaveToText(), Before);
  // A chosen colour that is no colour is refused before anything changes.
  DialogScript().Answer(mrOk, {"not a colour"});
  EXPECT_EQ(ErrorOf<EConvertError>([&] { PropertyOf({G}, "Color")->Edit(); }),
            "'not a colour' is not a valid integer value");
  EXPECT_EQ(G->FColor, clBlue);
}

TEST_F(KilnColorEditorsTest, BrushAndPenStylesDrawASampleBeforeTheirName) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> Brush = PropertyOf({G}, "BrushStyle");
  IPtr<IProperty> Pen = PropertyOf({G}, "PenStyle");
  ASSERT_TRUE(EditorOf<TBrushStyleProperty>(Brush) && EditorOf<TPenStyleProperty>(Pen));

  QueryAs<ICustomPropertyListDrawing>(Brush)->ListDrawValue("bsCross", Canvas.Get(), Rect(0, 0, 100, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"Brush clWindow bsSolid", "Pen clWhite psSolid", "Rectangle(0,0,16,16)",
                            "Brush clWindowText bsCross", "Pen clWindowText psSolid", "Rectangle(1,1,15,15)",
                            "Brush clWhite bsSolid", "Pen clBlack psSolid", "FillRect(16,0,100,16)",
                            "TextRect(25,0,100,16,25,2,\"bsCross\")"}));
  // A clear brush shows as a solid window-coloured sample.
  QueryAs<ICustomPropertyListDrawing>(Brush)->ListDrawValue("bsClear", Canvas.Get(), Rect(0, 0, 100, 16), false);
  Texts Clear = Drawn();
  EXPECT_EQ(Clear[3], "Pen clWindowText psSolid");
  EXPECT_EQ(Clear[4], "Rectangle(1,1,15,15)") << "drawn in the wiping brush, clWindow bsSolid";

  QueryAs<ICustomPropertyListDrawing>(Pen)->ListDrawValue("psDot", Canvas.Get(), Rect(0, 0, 100, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"Brush clWindow bsSolid", "Pen clWhite psSolid", "Rectangle(0,0,32,16)",
                            "Pen clWindowText psSolid", "FrameRect(0,0,32,16)", "Pen clWindowText psDot",
                            "MoveTo(1,8)", "LineTo(31,8)", "MoveTo(1,9)", "LineTo(31,9)", "Brush clWhite bsSolid",
                            "Pen clBlack psSolid", "FillRect(32,0,100,16)", "TextRect(41,0,100,16,41,2,\"psDot\")"}));

  int BrushWidth = 10, PenWidth = 10;
  QueryAs<ICustomPropertyListDrawing>(Brush)->ListMeasureWidth("bsCross", Canvas.Get(), BrushWidth);
  QueryAs<ICustomPropertyListDrawing>(Pen)->ListMeasureWidth("psDot", Canvas.Get(), PenWidth);
  EXPECT_EQ(BrushWidth, 22);
  EXPECT_EQ(PenWidth, 34);
  EXPECT_EQ(ValuesOf(Pen), (Texts{"psSolid", "psDash", "psDot", "psDashDot", "psDashDotDot", "psClear"}));

  // The row is the plain text; the texts are the enumeration's.
  G->FPenStyle = psDash;
  QueryAs<ICustomPropertyDrawing>(Pen)->PropDrawValue(Canvas.Get(), Rect(100, 0, 200, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"TextRect(101,0,200,16,101,2,\"psDash\")"}));
  Brush->SetValue("bsFDiagonal");
  EXPECT_EQ(G->FBrushStyle, bsFDiagonal);
}

} // namespace
