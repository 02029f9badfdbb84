//===- tests/frameworks/kiln/design/KilnCheckBoxEditorsTest.cpp - Booleans and set elements as check boxes ===//
//
// Booleans and the elements of sets drawn as check boxes (checked, clear, mixed,
// disabled) and toggled by a click on the box; the display value and the list of
// selection messages.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnEditorsFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

using Texts = std::vector<String>;

struct KilnCheckBoxEditorsTest : KilnEditorsFixture {
  /// The nested editor of element `Name` of the gadget's "Styles".
  IPtr<IProperty> ElementOf(TValueGadget* G, const String& Name) {
    IPtr<IProperty> Found;
    PropertyOf({G}, "Styles")->GetProperties([&](const IPtr<IProperty>& P) {
      if (P->GetName() == Name) Found = P;
    });
    return Found;
  }
  /// A left click released at (X, Y) on the row `Item`; whether the editor handled it.
  static bool ClickAt(const IPtr<IProperty>& P, int X, int Y, bool InNameRect = false) {
    bool Handled = true;
    QueryAs<ICustomPropertyMessage>(P)->MouseUp(mbLeft, {}, X, Y, InNameRect, Item, Handled);
    return Handled;
  }
  static inline const TRect Item = Rect(100, 0, 116, 16);
};

const Texts Frame = {"Brush clWindow bsSolid", "FillRect(100,0,116,16)", "Brush clWindowText bsSolid",
                     "FrameRect(100,0,116,16)"};

Texts Plus(Texts A, const Texts& B) {
  A.insert(A.end(), B.begin(), B.end());
  return A;
}

TEST_F(KilnCheckBoxEditorsTest, BooleansAreDrawnAsCheckBoxesClearCheckedOrMixed) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Flag");
  ASSERT_TRUE(EditorOf<TBooleanProperty>(P));
  EXPECT_EQ(P->GetValue(), "False");
  auto Drawing = QueryAs<ICustomPropertyDrawing80>(P);
  EXPECT_EQ(Drawing->PropDrawValueRect(Rect(100, 0, 300, 16)), Item);
  EXPECT_EQ(Drawing->PropDrawNameRect(Rect(0, 0, 100, 16)), Rect(0, 0, 100, 16));

  Drawing->PropDrawValue(Canvas.Get(), Item, false);
  EXPECT_EQ(Drawn(), Frame);
  P->SetValue("True");
  Drawing->PropDrawValue(Canvas.Get(), Item, false);
  EXPECT_EQ(Drawn(), Plus(Frame, {"Pen clWindowText psSolid", "MoveTo(103,8)", "LineTo(106,12)", "LineTo(113,3)"}));
  EXPECT_EQ(Canvas->Pen()->Color(), clBlack) << "the canvas is given back as it was";

  TValueGadget* Other = MakeGadget();
  QueryAs<ICustomPropertyDrawing>(PropertyOf({G, Other}, "Flag"))->PropDrawValue(Canvas.Get(), Item, false);
  EXPECT_EQ(Drawn(), Plus(Frame, {"Brush clGrayText bsSolid", "FillRect(103,3,113,13)"}));

  // A read-only Boolean is drawn disabled.
  QueryAs<ICustomPropertyDrawing>(PropertyOf({G}, "Locked"))->PropDrawValue(Canvas.Get(), Item, false);
  EXPECT_EQ(Drawn(), (Texts{"Brush clBtnFace bsSolid", "FillRect(100,0,116,16)", "Brush clGrayText bsSolid",
                            "FrameRect(100,0,116,16)", "Pen clGrayText psSolid", "MoveTo(103,8)", "LineTo(106,12)",
                            "LineTo(113,3)"}));
  Drawing->PropDrawName(Canvas.Get(), Rect(0, 0, 100, 16), false);
  EXPECT_EQ(Drawn(), (Texts{"TextRect(2,0,100,16,2,2,\"Flag\")"}));
}

TEST_F(KilnCheckBoxEditorsTest, AClickOnTheBoxTogglesTheBooleanOfEveryObject) {
  TValueGadget* One = MakeGadget();
  TValueGadget* Two = MakeGadget();
  IPtr<IProperty> P = PropertyOf({One}, "Flag");
  // The box lies right of the rectangle given: from its right edge + 4 to right + height.
  EXPECT_EQ(EditorOf<TBooleanProperty>(P)->CBRect(Item), Rect(120, 0, 132, 16));
  EXPECT_FALSE(ClickAt(P, 110, 8)) << "beside the box";
  EXPECT_FALSE(ClickAt(P, 125, 8, true)) << "in the name";
  EXPECT_FALSE(One->FFlag);
  EXPECT_TRUE(ClickAt(P, 125, 8));
  EXPECT_TRUE(One->FFlag);
  EXPECT_TRUE(ClickAt(P, 120, 15));
  EXPECT_FALSE(One->FFlag);

  // A mixed selection: 1 less the first object's value, written to all.
  One->FFlag = true;
  IPtr<IProperty> Both = PropertyOf({One, Two}, "Flag");
  EXPECT_TRUE(ClickAt(Both, 125, 8));
  EXPECT_FALSE(One->FFlag);
  EXPECT_FALSE(Two->FFlag);

  // A read-only Boolean ignores clicks; the other mouse events are never handled.
  IPtr<IProperty> Locked = PropertyOf({One}, "Locked");
  EXPECT_FALSE(ClickAt(Locked, 125, 8));
  EXPECT_TRUE(One->FLocked);
  bool Handled = true;
  auto Message = QueryAs<ICustomPropertyMessage>(P);
  Message->MouseDown(mbLeft, {}, 125, 8, false, Item, Handled);
  EXPECT_FALSE(Handled);
  Handled = true;
  Message->MouseMove({}, 125, 8, false, Item, Handled);
  EXPECT_FALSE(Handled);
  Handled = true;
  THintInfo Hint;
  Message->HintShow(Hint, false, Item, Handled);
  EXPECT_FALSE(Handled);
}

TEST_F(KilnCheckBoxEditorsTest, SetElementsAreCheckBoxesThatToggleTheirBit) {
  TValueGadget* G = MakeGadget();
  G->FStyles = TFontStyles{fsItalic};
  IPtr<IProperty> Set = PropertyOf({G}, "Styles");
  ASSERT_TRUE(EditorOf<KilnEditors::TSetProperty>(Set));
  EXPECT_EQ(Set->GetValue(), "[fsItalic]");
  Texts Names;
  Set->GetProperties([&](const IPtr<IProperty>& P) {
    EXPECT_TRUE(EditorOf<KilnEditors::TSetElementProperty>(P)) << P->GetName();
    Names.push_back(P->GetName());
  });
  EXPECT_EQ(Names, (Texts{"fsBold", "fsItalic", "fsUnderline", "fsStrikeOut"}));

  IPtr<IProperty> Bold = ElementOf(G, "fsBold");
  IPtr<IProperty> Italic = ElementOf(G, "fsItalic");
  EXPECT_EQ(EditorOf<KilnEditors::TSetElementProperty>(Italic)->Bit(), 1);
  QueryAs<ICustomPropertyDrawing>(Bold)->PropDrawValue(Canvas.Get(), Item, false);
  EXPECT_EQ(Drawn(), Frame);
  QueryAs<ICustomPropertyDrawing>(Italic)->PropDrawValue(Canvas.Get(), Item, false);
  EXPECT_EQ(Drawn(), Plus(Frame, {"Pen clWindowText psSolid", "MoveTo(103,8)", "LineTo(106,12)", "LineTo(113,3)"}));
  EXPECT_EQ(QueryAs<ICustomPropertyDrawing80>(Bold)->PropDrawValueRect(Rect(100, 0, 300, 16)), Item);

  // The box: from the right edge + 2 to right + height + 2; the name is no exception.
  EXPECT_EQ(EditorOf<KilnEditors::TSetElementProperty>(Bold)->CBRect(Item), Rect(118, 0, 134, 16));
  EXPECT_FALSE(ClickAt(Bold, 117, 8));
  EXPECT_TRUE(ClickAt(Bold, 118, 8, true));
  EXPECT_EQ(G->FStyles, (TFontStyles{fsBold, fsItalic}));
  EXPECT_TRUE(ClickAt(Italic, 133, 15));
  EXPECT_EQ(G->FStyles, (TFontStyles{fsBold}));
  EXPECT_EQ(Bold->GetValue(), "True") << "the text forms are those of the general element editor";
}

/// A selection editor with nothing to offer, and one that also takes selection messages.
class TPlainSelectionEditor : public TInterfacedObject, public ISelectionEditor {
  FK_CLASS(TPlainSelectionEditor, TInterfacedObject)
  FK_INTERFACES(ISelectionEditor)
  void ExecuteVerb(int, const IPtr<IDesignerSelections>&) override {}
  String GetVerb(int) override { return String(); }
  int GetVerbCount() override { return 0; }
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  void RequiresUnits(const TGetStrProc&) override {}
};
class TListeningSelectionEditor : public TPlainSelectionEditor, public ISelectionMessage {
  FK_CLASS(TListeningSelectionEditor, TPlainSelectionEditor)
  FK_INTERFACES(ISelectionMessage)
  bool IsSelectionMessage(TControl*, TMessage&) override { return true; }
};
class TEditorList : public TInterfacedObject, public ISelectionEditorList {
  FK_CLASS(TEditorList, TInterfacedObject)
  FK_INTERFACES(ISelectionEditorList)
  IPtr<ISelectionEditor> Get(int Index) override { return Editors[static_cast<size_t>(Index)]; }
  int GetCount() override { return static_cast<int>(Editors.size()); }
  std::vector<IPtr<ISelectionEditor>> Editors;
};

FK_IMPLEMENT(TPlainSelectionEditor, "KilnEditorsTest") {}
FK_IMPLEMENT(TListeningSelectionEditor, "KilnEditorsTest") {}
FK_IMPLEMENT(TEditorList, "KilnEditorsTest") {}

TEST_F(KilnCheckBoxEditorsTest, DisplayValuesWideListTextsAndSelectionMessageLists) {
  TValueGadget* One = MakeGadget();
  TValueGadget* Two = MakeGadget();
  EXPECT_EQ(GetDisplayValue(nullptr), "");
  EXPECT_EQ(GetDisplayValue(PropertyOf({One, Two}, "Color")), "clRed");
  Two->FColor = clBlue;
  EXPECT_EQ(GetDisplayValue(PropertyOf({One, Two}, "Color")), "") << "the objects disagree";

  // The wide list text: at left + offset + 1 and top + 1, clipped to the rectangle.
  DefaultPropertyListDrawValue(WideString(u"Wide"), Canvas.Get(), Rect(0, 0, 100, 16), false, 4);
  EXPECT_EQ(Drawn(), (Texts{"FillRect(0,0,100,16)", "TextRect(0,0,100,16,5,1,\"Wide\")"}));

  EXPECT_EQ(SelectionMessageListOf(nullptr)->GetCount(), 0);
  IPtr<TEditorList> List = New<TEditorList>();
  IPtr<TListeningSelectionEditor> First = New<TListeningSelectionEditor>(), Third = New<TListeningSelectionEditor>();
  List->Editors = {QueryAs<ISelectionEditor>(First.Get()), QueryAs<ISelectionEditor>(New<TPlainSelectionEditor>().Get()),
                   QueryAs<ISelectionEditor>(Third.Get())};
  IPtr<ISelectionMessageList> Messages = SelectionMessageListOf(QueryAs<ISelectionEditorList>(List.Get()));
  ASSERT_EQ(Messages->GetCount(), 2);
  EXPECT_EQ(Messages->Get(0).Get(), static_cast<ISelectionMessage*>(First.Get()));
  EXPECT_EQ(Messages->Get(1).Get(), static_cast<ISelectionMessage*>(Third.Get()));
}

} // namespace
