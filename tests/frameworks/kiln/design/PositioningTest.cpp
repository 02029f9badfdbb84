//===- tests/frameworks/kiln/design/PositioningTest.cpp - Lining up the selection ===//
//
// The positioning commands on a Kiln form: aligning to the anchor, spacing evenly,
// stepping and removing the spacing around the anchor, centring in the parent,
// sizing, the grid, the stacking order, selecting all, mirroring, and reverting
// inherited components; each ending with one report of a change.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

struct PositioningTest : KilnDesignFixture {
  IPtr<IRoot> Form;
  TKilnRoot* Kiln = nullptr;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Form = NewForm("Form1");
    Kiln = KilnRoot(Form);
  }
  void TearDown() override {
    Kiln = nullptr;
    Form = nullptr;
    KilnDesignFixture::TearDown();
  }
  /// A button at exactly these bounds.
  TButton* Button(int L, int T, int W, int H) {
    auto* B = static_cast<TButton*>(Kiln->CreateComponent(TButton::StaticClass(), Form->GetRoot(), L, T, W, H));
    B->SetBounds(L, T, W, H);
    return B;
  }
  void Select(std::initializer_list<TComponent*> Components) {
    bool Add = false;
    for (TComponent* C : Components) {
      Kiln->SelectComponent(C, Add);
      Add = true;
    }
  }
  std::vector<int> Lefts(std::initializer_list<TControl*> Controls) {
    std::vector<int> L;
    for (TControl* C : Controls) L.push_back(C->Left());
    return L;
  }
  int Changes() const { return Log.Count("Modified"); }
};

TEST_F(PositioningTest, AligningToTheAnchorUsesItsEdgesAndHalves) {
  TButton* A = Button(0, 0, 11, 20);
  TButton* B = Button(40, 30, 10, 20);
  TButton* C = Button(80, 60, 30, 20);
  Select({A, B, C});
  Log.Clear();
  Kiln->Align(afHCenter); // the anchor's centre: 0 + 11 div 2 = 5
  EXPECT_EQ(Lefts({A, B, C}), (std::vector<int>{0, 0, -10}));
  EXPECT_EQ(Changes(), 1);
  Kiln->Align(afRight);
  EXPECT_EQ(Lefts({A, B, C}), (std::vector<int>{0, 1, -19}));
  Kiln->Align(afBottom);
  EXPECT_EQ(B->Top(), 0);
  EXPECT_EQ(C->Top(), 0);
  // A selected root refuses, without a report; an empty selection only reports.
  Kiln->SelectComponent(Form->GetRoot());
  Log.Clear();
  Kiln->Align(afLeft);
  EXPECT_EQ(Changes(), 0);
  Kiln->ClearSelection();
  Kiln->Align(afLeft);
  EXPECT_EQ(Changes(), 1);
  // Snapping is toggled only with a selection.
  Select({A});
  bool Snap = Kiln->SurfaceDesigner()->GetGridAligned();
  Kiln->Align(afSnapToGrid);
  EXPECT_NE(Kiln->SurfaceDesigner()->GetGridAligned(), Snap);
}

TEST_F(PositioningTest, SpacingIsEvenSteppedOrRemovedAroundTheAnchor) {
  TButton* A = Button(0, 0, 10, 10);
  TButton* B = Button(100, 0, 10, 10);
  TButton* C = Button(10, 0, 10, 10);
  TButton* D = Button(50, 0, 10, 10);
  Select({A, B, C, D});
  Kiln->Align(afHSpace); // left edges 0 .. 100 spaced evenly, in left order
  EXPECT_EQ(Lefts({A, C, D, B}), (std::vector<int>{0, 33, 66, 100}));
  // Anchor C in the middle: its neighbours move away from it by 1, 2, ...
  Select({C, A, D, B});
  Kiln->Align(afHSpaceInc);
  EXPECT_EQ(Lefts({A, C, D, B}), (std::vector<int>{-1, 33, 67, 102}));
  Kiln->Align(afHSpaceDec);
  EXPECT_EQ(Lefts({A, C, D, B}), (std::vector<int>{0, 33, 66, 100}));
  // Removing the spacing closes everything up against the anchor.
  Kiln->Align(afHSpaceDel);
  EXPECT_EQ(Lefts({A, C, D, B}), (std::vector<int>{23, 33, 43, 53}));
  // One item: nothing moves, the report still comes.
  Select({A});
  Log.Clear();
  Kiln->Align(afHSpace);
  Kiln->Align(afHSpaceDel);
  EXPECT_EQ(A->Left(), 23);
  EXPECT_EQ(Changes(), 2);
}

TEST_F(PositioningTest, ItemsOnTheAnchorsEdgeStayWhenTheSpacingShrinksAndOverlapsCountAsNoGap) {
  TButton* A = Button(50, 0, 10, 10);
  TButton* B = Button(50, 20, 10, 10);
  TButton* C = Button(80, 40, 10, 10);
  TButton* D = Button(20, 60, 40, 10); // overlaps the anchor
  Select({A, B, C, D});
  Kiln->Align(afHSpaceDec);
  EXPECT_EQ(Lefts({A, B, C, D}), (std::vector<int>{50, 50, 79, 21}));
  Kiln->Align(afHSpaceDel);
  EXPECT_EQ(Lefts({A, B, C, D}), (std::vector<int>{50, 50, 60, 21}));
}

TEST_F(PositioningTest, CentringMovesTheGroupAsAWhole) {
  auto* Root = static_cast<TForm*>(Form->GetRoot());
  Root->SetClientWidth(400);
  Root->SetClientHeight(300);
  TButton* A = Button(0, 0, 50, 20);
  TButton* B = Button(100, 40, 50, 20);
  Select({A, B});
  Kiln->Align(afHWinCenter); // union 0..150: delta (400 - 0 - 150) div 2 = 125
  EXPECT_EQ(Lefts({A, B}), (std::vector<int>{125, 225}));
  Kiln->Align(afVWinCenter); // union 0..60: delta (300 - 60) div 2 = 120
  EXPECT_EQ(A->Top(), 120);
  EXPECT_EQ(B->Top(), 160);
}

TEST_F(PositioningTest, SizingTakesTheLargestTheSmallestOrTheAnchorsSize) {
  TButton* A = Button(0, 0, 30, 20);
  TButton* B = Button(0, 40, 50, 10);
  TButton* C = Button(0, 80, 40, 30);
  Select({A, B, C});
  Kiln->Size(asHGrow, 0);
  EXPECT_EQ(B->Width(), 50);
  EXPECT_EQ(A->Width(), 50);
  Kiln->Size(asVShrink, 0);
  EXPECT_EQ(C->Height(), 10);
  Kiln->Size(asHAbsolute, 64);
  EXPECT_EQ(C->Width(), 64);
  A->SetBounds(0, 0, 30, 20);
  Kiln->Size(asWidthHeight, 0);
  EXPECT_EQ(B->BoundsRect(), Rect(0, 40, 30, 60));
  Log.Clear();
  Kiln->Size(asSizeToGrid, 0);
  EXPECT_EQ(Changes(), 1) << "changes nothing, still reported";
}

TEST_F(PositioningTest, GridOrderSelectAllAndMirroring) {
  auto* Root = static_cast<TForm*>(Form->GetRoot());
  Root->SetClientWidth(400);
  TButton* A = Button(13, 21, 75, 25);
  TButton* B = Button(100, 100, 75, 25);
  TComponent* Timer = Kiln->CreateComponent(TTimer::StaticClass(), Root, 300, 8, 0, 0);
  Select({A});
  Kiln->AlignToGrid();
  EXPECT_EQ(A->BoundsRect(), Rect(16, 24, 91, 49));
  // The last selected ends on top.
  Select({B, A});
  Kiln->BringToFront();
  EXPECT_EQ(Root->Controls(Root->ControlCount() - 1), A);
  Kiln->SendToBack();
  EXPECT_EQ(Root->Controls(0), A);
  Kiln->SelectAll();
  IPtr<IDesignerSelections> All = Kiln->GetSelection();
  EXPECT_EQ(All->GetCount(), 3);
  EXPECT_EQ(All->Get(2), Timer);
  // Mirroring right to left within the form's client width.
  QueryAs<IFlipChildren>(Form)->FlipChildren(false);
  EXPECT_EQ(A->Left(), 400 - 16 - 75);
  EXPECT_EQ(B->Left(), 400 - 100 - 75);
}

TEST_F(PositioningTest, RevertThrowsInheritedComponentsAwayAndTheAncestorBringsThemBack) {
  TButton* A = Button(8, 8, 75, 25);
  A->SetCaption("Base");
  Kiln->CreateComponent(TPanel::StaticClass(), Form->GetRoot(), 100, 8, 185, 41);
  IPtr<IRoot> Heir = NewDescendant("Form2", "Form1");
  TKilnRoot* Heir2 = KilnRoot(Heir);
  auto* Copy = static_cast<TButton*>(Heir->GetRoot()->FindComponent("Button1"));
  Copy->SetCaption("Mine");
  Heir2->Modified();
  auto* Panel = Heir->GetRoot()->FindComponent("Panel1");
  Heir2->CreateComponent(TEdit::StaticClass(), Panel, 8, 8, 121, 23); // the heir's own
  Heir2->SelectComponent(Copy);
  Heir2->SelectComponent(Panel, true);
  EXPECT_TRUE(Heir2->CanRevert());
  // Cancelled on the panel, whose own edit would go: nothing was freed.
  std::vector<String> Asked;
  TKilnRoot::DeleteWarningAnswer = [&](const String& Question) {
    Asked.push_back(Question);
    return dwCancel;
  };
  auto Reset = Finally([]() noexcept { TKilnRoot::DeleteWarningAnswer = nullptr; });
  Heir2->Command(dmRevert);
  EXPECT_EQ(Asked, std::vector<String>{"Reverting 'Panel1' deletes all contained components not found in the "
                                       "ancestor and will delete the following: Edit1.  Continue?"});
  EXPECT_EQ(static_cast<TButton*>(Heir->GetRoot()->FindComponent("Button1"))->Caption(), "Mine");
  // Answered no for the panel: only the button goes back to the ancestor's.
  TKilnRoot::DeleteWarningAnswer = [](const String&) { return dwNo; };
  Heir2->Command(dmRevert);
  auto* Again = static_cast<TButton*>(Heir->GetRoot()->FindComponent("Button1"));
  ASSERT_NE(Again, nullptr);
  EXPECT_EQ(Again->Caption(), "Base");
  EXPECT_NE(Heir->GetRoot()->FindComponent("Edit1"), nullptr);
  // Answered yes: the panel goes back to the ancestor's, without the heir's own edit.
  TKilnRoot::DeleteWarningAnswer = [](const String&) { return dwYes; };
  Heir2->SelectComponent(Heir->GetRoot()->FindComponent("Panel1"));
  Heir2->Command(dmRevert);
  EXPECT_NE(Heir->GetRoot()->FindComponent("Panel1"), nullptr);
  EXPECT_EQ(Heir->GetRoot()->FindComponent("Edit1"), nullptr);
  // The ancestor module itself has nothing inherited to revert.
  Kiln->SelectComponent(A);
  EXPECT_FALSE(Kiln->CanRevert());
}

} // namespace
