//===- tests/frameworks/kiln/design/KilnGuidelinesTest.cpp - Guides of Kiln controls ===//
//
// The guides that Kiln controls, containers and forms offer, read through their
// items as the snapping of a drag reads them, and drags that snap to them.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include <algorithm>
#include <functional>
#include <ostream>
#include <utility>
#include <vector>

namespace formkit {
/// Guide kinds by name in failure messages.
void PrintTo(TDesignerGuideType Type, std::ostream* Os) { *Os << GetEnumName(TypeInfo<TDesignerGuideType>(), Type); }
} // namespace formkit

using namespace formkit;
using namespace formkit::fakes;

namespace {

using TGuides = std::vector<std::pair<TGuideType, int>>;

struct KilnGuidelinesTest : KilnDesignFixture {
  IPtr<IRoot> Root;
  TKilnRoot* Kiln = nullptr;
  TKilnSurface* S = nullptr;
  TCustomForm* Form = nullptr;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Root = NewForm("Form1");
    Kiln = KilnRoot(Root);
    S = KilnSurfaceOf(Root);
    Form = static_cast<TCustomForm*>(Root->GetRoot());
    Form->SetBounds(0, 0, 400, 300); // a client area of 384 by 261 at (8, 31)
  }
  void TearDown() override {
    Root = nullptr;
    KilnDesignFixture::TearDown();
  }

  template <class T> T* Make(TComponent* Parent, int Left, int Top, int Width, int Height) {
    return static_cast<T*>(Kiln->CreateComponent(T::StaticClass(), Parent, Left, Top, Width, Height));
  }
  /// The guides of `C`'s item on the surface, as the snapping reads them.
  TGuides GuidesOf(TComponent* C) {
    IPtr<IItemEx> Item = QueryAs<IItemEx>(S->ItemFromComponent(C));
    EXPECT_TRUE(Item->HasGuidelines());
    IPtr<IItemGuidelines> G = Item->GetItemGuidelines();
    TGuides Result;
    for (int I = 0; I < G->GetCount(); ++I) Result.emplace_back(G->GetDesignerGuideType(I), G->GetDesignerGuideOffset(I));
    return Result;
  }
  /// The guides of a control in the order every control gives them, from its bounds and
  /// margins in the form's client area.
  static TGuides Outline(const TRect& B, const TRect& M = {3, 3, 3, 3}) {
    return {{gtAlignLeft, B.Left},
            {gtAlignTop, B.Top},
            {gtAlignRight, B.Right - 1},
            {gtAlignBottom, B.Bottom - 1},
            {gtMarginLeft, B.Left - M.Left},
            {gtMarginTop, B.Top - M.Top},
            {gtMarginRight, B.Right + M.Right},
            {gtMarginBottom, B.Bottom + M.Bottom}};
  }
  static TGuides Padded(TGuides Guides, const TRect& P) {
    Guides.insert(Guides.end(), {{gtPaddingLeft, P.Left},
                                 {gtPaddingTop, P.Top},
                                 {gtPaddingRight, P.Right},
                                 {gtPaddingBottom, P.Bottom}});
    return Guides;
  }
  static TClass ClassOf(const IPtr<IComponentGuidelines>& G) { return dynamic_cast<TObject*>(G.Get())->ClassType(); }
  static String MessageOf(const std::function<void()>& F) {
    try {
      F();
    } catch (const Exception& E) {
      return String(E.ClassName()) + ": " + E.Message();
    }
    return "no error";
  }
};

TEST_F(KilnGuidelinesTest, AControlGivesItsEdgesAndTheOuterLinesOfItsMargins) {
  auto* Button = Make<TButton>(Form, 16, 24, 75, 25);
  auto* Label = Make<TLabel>(Form, 120, 40, 50, 13);
  EXPECT_EQ(GuidesOf(Button), Outline(Rect(16, 24, 91, 49)));
  EXPECT_EQ(GuidesOf(Label), Outline(Rect(120, 40, 170, 53)));

  Button->SetMargins(Rect(1, 2, 4, 8));
  EXPECT_EQ(GuidesOf(Button), Outline(Rect(16, 24, 91, 49), Rect(1, 2, 4, 8)));
  // The item's padded bounds are the bounds with the margins around them.
  EXPECT_EQ(QueryAs<IItemEx>(S->ItemFromComponent(Button))->GetPaddedBoundsRect(), Rect(15, 22, 95, 57));

  // Each class is served by its own registration; none of them moves anything.
  EXPECT_EQ(ClassOf(GuidelinesFor(nullptr, Button, Form)), TWinControlGuidelines::StaticClass());
  EXPECT_EQ(ClassOf(GuidelinesFor(nullptr, Label, Form)), TControlGuidelines::StaticClass());
  EXPECT_EQ(ClassOf(GuidelinesFor(nullptr, Form, Form)), TCustomFormGuidelines::StaticClass());
  EXPECT_EQ(Button->BoundsRect(), Rect(16, 24, 91, 49));
}

TEST_F(KilnGuidelinesTest, AContainerAddsItsPaddingAndItsChildrenSpeakInTheFormsCoordinates) {
  auto* Panel = Make<TPanel>(Form, 16, 16, 200, 100);
  auto* Inner = Make<TPanel>(Panel, 8, 24, 150, 60); // creation keeps to the grid
  auto* Button = Make<TButton>(Inner, 8, 8, 75, 25);
  EXPECT_EQ(GuidesOf(Panel), Padded(Outline(Rect(16, 16, 216, 116)), Rect(16, 16, 216, 116)));
  Panel->SetPadding(Rect(2, 3, 4, 5));
  EXPECT_EQ(GuidesOf(Panel), Padded(Outline(Rect(16, 16, 216, 116)), Rect(18, 19, 212, 111)));
  // Two containers down, the offsets add up: (16 + 8 + 8, 16 + 24 + 8).
  EXPECT_EQ(GuidesOf(Inner), Padded(Outline(Rect(24, 40, 174, 100)), Rect(24, 40, 174, 100)));
  EXPECT_EQ(GuidesOf(Button), Outline(Rect(32, 48, 107, 73)));

  // Padding guides come with accepting children, not with the class...
  Inner->SetControlStyle(Inner->ControlStyle() - TControlStyle{csAcceptsControls});
  EXPECT_EQ(GuidesOf(Inner).size(), 8u);
  // ...and a frame has them whatever its style says.
  TObjectGuard<TFrame> Frame(CreateComponentOf<TFrame>(nullptr));
  Frame->SetBounds(4, 6, 100, 50);
  Frame->SetControlStyle({});
  IPtr<IComponentGuidelines> G = GuidelinesFor(nullptr, Frame.Get(), nullptr);
  ASSERT_EQ(G->GetCount(), 12);
  EXPECT_EQ(G->GetDesignerGuideType(11), gtPaddingBottom);
  // Without a container above it, a control speaks in its parent's coordinates.
  EXPECT_EQ(G->GetDesignerGuideOffset(0), 4);
  EXPECT_EQ(G->GetDesignerGuideOffset(10), 104);
  EXPECT_EQ(G->GetDesignerGuideOffset(11), 56);
}

TEST_F(KilnGuidelinesTest, TheFormIsMeasuredFromItsClientAreaAndPadsByFiveWithoutPadding) {
  // The form is the container: its offsets lose the client delta of (8, 31).
  IPtr<IComponentGuidelines> FormGuides = GuidelinesFor(nullptr, Form, Form);
  auto* Guides = dynamic_cast<TCustomFormGuidelines*>(FormGuides.Get());
  ASSERT_NE(Guides, nullptr);
  EXPECT_EQ(Guides->ClientDelta(), Point(8, 31));
  EXPECT_EQ(GuidesOf(Form), Padded(Outline(Rect(-8, -31, 392, 269)), Rect(5, 5, 379, 256)));
  // Any padding of its own is taken as it is.
  Form->SetPadding(Rect(10, 0, 0, 0));
  EXPECT_EQ(GuidesOf(Form), Padded(Outline(Rect(-8, -31, 392, 269)), Rect(10, 0, 384, 261)));
  Form->SetPadding({});
  // Without a frame the client area is the bounds.
  Form->SetBorderStyle(bsNone);
  EXPECT_EQ(GuidesOf(Form), Padded(Outline(Rect(0, 0, 400, 300)), Rect(5, 5, 395, 295)));
  // Any other control has no client delta, whatever its container.
  auto* Panel = Make<TPanel>(Form, 16, 16, 200, 100);
  IPtr<IComponentGuidelines> OfPanel = GuidelinesFor(nullptr, Panel, Form);
  auto* PanelGuides = dynamic_cast<TControlGuidelines*>(OfPanel.Get());
  ASSERT_NE(PanelGuides, nullptr);
  EXPECT_EQ(PanelGuides->ClientDelta(), Point(0, 0));
}

TEST_F(KilnGuidelinesTest, AMoveSnapsToANeighboursRightEdgeAndStopsAtTheMargins) {
  auto* Top = Make<TButton>(Form, 16, 24, 75, 25);
  auto* Below = Make<TButton>(Form, 16, 88, 60, 25);
  auto* Beside = Make<TButton>(Form, 120, 24, 75, 25);
  S->Canvas()->ClearLines();

  // 13 to the right: the grid would give 16; the right edge is pulled onto Top's, 2 further.
  Drag(S, {30, 98}, {43, 98});
  EXPECT_EQ(Below->BoundsRect(), Rect(31, 88, 91, 113));
  EXPECT_EQ(Below->BoundsRect().Right, Top->BoundsRect().Right);
  // The coincidence was shown as a line from Top down to the dragged button, and the
  // line went when the drag ended.
  const std::vector<String>& Lines = S->Canvas()->Lines();
  EXPECT_NE(std::find(Lines.begin(), Lines.end(), "MoveTo(90,24)"), Lines.end());
  EXPECT_NE(std::find(Lines.begin(), Lines.end(), "LineTo(90,113)"), Lines.end());
  EXPECT_TRUE(S->GuideLines().empty());

  // 22 to the left: the grid would give 24; the left margin meets Top's right margin one
  // pixel before, leaving both margins between them.
  Drag(S, {150, 36}, {128, 36});
  EXPECT_EQ(Beside->BoundsRect(), Rect(97, 24, 172, 49));
  EXPECT_EQ(Beside->Left() - Top->BoundsRect().Right, 6);

  // With the guides switched off the grid alone rules.
  Kiln->SurfaceDesigner()->SetGuidelines(false);
  Drag(S, {40, 98}, {53, 98});
  EXPECT_EQ(Below->BoundsRect(), Rect(47, 88, 107, 113));
}

TEST_F(KilnGuidelinesTest, AChildStopsAtTheMarginPlusThePaddingOfItsContainer) {
  auto* Panel = Make<TPanel>(Form, 16, 16, 200, 100);
  auto* Button = Make<TButton>(Panel, 16, 16, 75, 25);
  Panel->SetPadding(Rect(4, 4, 4, 4));
  // 5 to the left and up: the margins (3) meet the padding (4) at 7 from the client edge.
  Drag(S, {50, 50}, {45, 45});
  EXPECT_EQ(Button->BoundsRect(), Rect(7, 7, 82, 32));
  // The form without padding stops its children 3 + 5 from its client edge.
  auto* Free = Make<TButton>(Form, 16, 152, 75, 25);
  Drag(S, {30, 160}, {25, 160});
  EXPECT_EQ(Free->BoundsRect(), Rect(8, 152, 83, 177));
}

TEST_F(KilnGuidelinesTest, GuidesOfTheWrongKindOrIndexAreRefused) {
  auto* Label = Make<TLabel>(Form, 8, 8, 50, 13);
  auto* Panel = Make<TPanel>(Form, 16, 40, 200, 100);
  TComponent* Timer = Kiln->CreateComponent(TTimer::StaticClass(), Form, 0, 0, 0, 0);
  RegisterComponentGuidelines(TLabel::StaticClass(), TWinControlGuidelines::StaticClass());
  RegisterComponentGuidelines(TPanel::StaticClass(), TCustomFormGuidelines::StaticClass());
  RegisterComponentGuidelines(TTimer::StaticClass(), TControlGuidelines::StaticClass());
  EXPECT_EQ(MessageOf([&] { static_cast<void>(GuidelinesFor(nullptr, Label, Form)); }),
            "EInvalidCast: TWinControlGuidelines serves controls of class TWinControl, not TLabel");
  EXPECT_EQ(MessageOf([&] { static_cast<void>(GuidelinesFor(nullptr, Panel, Form)); }),
            "EInvalidCast: TCustomFormGuidelines serves controls of class TCustomForm, not TPanel");
  EXPECT_EQ(MessageOf([&] { static_cast<void>(GuidelinesFor(nullptr, Timer, Form)); }),
            "EInvalidCast: TControlGuidelines serves controls of class TControl, not TTimer");
  // A refused item passes the refusal on to whoever asked for its guides.
  EXPECT_THROW(QueryAs<IItemEx>(S->ItemFromComponent(Label))->GetItemGuidelines(), EInvalidCast);

  auto* Button = Make<TButton>(Form, 8, 160, 75, 25);
  IPtr<IComponentGuidelines> G = GuidelinesFor(nullptr, Button, Form);
  EXPECT_EQ(MessageOf([&] { G->GetDesignerGuideType(8); }), "EListError: List index out of bounds (8)");
  EXPECT_EQ(MessageOf([&] { G->GetDesignerGuideOffset(-1); }), "EListError: List index out of bounds (-1)");
  IPtr<IComponentGuidelines> F = GuidelinesFor(nullptr, Form, Form);
  EXPECT_EQ(MessageOf([&] { F->GetDesignerGuideType(12); }), "EListError: List index out of bounds (12)");
  EXPECT_EQ(MessageOf([&] { F->GetDesignerGuideOffset(12); }), "EListError: List index out of bounds (12)");
}

TEST_F(KilnGuidelinesTest, MarginsAndPaddingAreWidthsThatCannotBeNegative) {
  auto* Panel = Make<TPanel>(Form, 16, 16, 200, 100);
  EXPECT_EQ(Panel->Margins(), Rect(3, 3, 3, 3));
  EXPECT_EQ(Panel->Padding(), Rect(0, 0, 0, 0));
  EXPECT_EQ(MessageOf([&] { Panel->SetMargins(Rect(1, 1, -2, 1)); }),
            "EInvalidOperation: Margin width -2 is not valid: it must be 0 or more");
  EXPECT_EQ(MessageOf([&] { Panel->SetPadding(Rect(-1, 0, 0, 0)); }),
            "EInvalidOperation: Padding width -1 is not valid: it must be 0 or more");
  EXPECT_EQ(Panel->Margins(), Rect(3, 3, 3, 3));
  EXPECT_EQ(Panel->Padding(), Rect(0, 0, 0, 0));
  Panel->SetMargins(Rect(0, 0, 0, 0));
  Panel->SetPadding(Rect(1, 2, 3, 4));
  EXPECT_EQ(Panel->Margins(), Rect(0, 0, 0, 0));
  EXPECT_EQ(Panel->Padding(), Rect(1, 2, 3, 4));
  // Neither is published: a form file does not change.
  EXPECT_EQ(TPanel::StaticClass()->FindProperty("Margins"), nullptr);
  EXPECT_EQ(TPanel::StaticClass()->FindProperty("Padding"), nullptr);
}

} // namespace
