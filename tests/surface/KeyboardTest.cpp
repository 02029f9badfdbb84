//===- tests/surface/KeyboardTest.cpp - Keys on a design surface ----------===//
#include "tests/surface/SurfaceFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// Items scattered around a centre item.
class NearestTest : public SurfaceTest {
protected:
  void SetUp() override {
    SurfaceTest::SetUp();
    Centre = S->AddControl(nullptr, "Centre", Bounds(200, 200, 40, 20));
    S->AddControl(nullptr, "Left", Bounds(100, 205, 40, 20));
    S->AddControl(nullptr, "LowLeft", Bounds(150, 300, 30, 20)); // nearer below than left
    S->AddControl(nullptr, "Right", Bounds(300, 190, 40, 20));
    S->AddControl(nullptr, "Up", Bounds(210, 100, 20, 20));
    S->AddControl(nullptr, "Down", Bounds(260, 260, 40, 20));
    TTestControl* Panel = S->AddControl(nullptr, "Panel", Bounds(400, 400, 100, 60), true);
    S->AddControl(Panel, "Inner", Bounds(0, 0, 10, 10)); // another parent: never reached
  }
  String Nearest(TTestControl* From, TDesignKeyCode Key) {
    return TTestSurface::NameOf(D->FindNearestItem(S->ItemOf(From), Key));
  }
  TTestControl* Centre = nullptr;
};

} // namespace

TEST_F(NearestTest, NearestItemInEachDirection) {
  EXPECT_EQ(Nearest(Centre, dkLeft), "Left");
  EXPECT_EQ(Nearest(Centre, dkRight), "Right");
  EXPECT_EQ(Nearest(Centre, dkUp), "Up");
  EXPECT_EQ(Nearest(Centre, dkDown), "Down");
  EXPECT_EQ(Nearest(S->Controls[1], dkLeft), "nil"); // nothing lies left of the leftmost
  EXPECT_EQ(Nearest(S->Controls[4], dkUp), "nil");
  EXPECT_EQ(TDesigner::SpanGap(10, 20, 20, 30), 0);
  EXPECT_EQ(TDesigner::SpanGap(10, 20, 25, 30), 5);
  EXPECT_EQ(TDesigner::SpanGap(40, 50, 25, 30), 10);
}

TEST_F(NearestTest, LowLeftIsReachedDownOnlyOnceDownIsGone) {
  S->Controls[5]->Bounds = Bounds(600, 460, 10, 10); // Down goes far away
  EXPECT_EQ(Nearest(Centre, dkDown), "LowLeft");
  EXPECT_EQ(Nearest(Centre, dkLeft), "Left");
}

TEST_F(SurfaceTest, NearestTiesGoToTheFirstAndOverlapsAreReached) {
  TTestControl* C = S->AddControl(nullptr, "C", Bounds(100, 100, 20, 20));
  S->AddControl(nullptr, "First", Bounds(100, 60, 20, 20));
  S->AddControl(nullptr, "Second", Bounds(100, 140, 20, 20));
  S->AddControl(nullptr, "Over", Bounds(105, 95, 20, 10)); // overlaps, centre to the right and up
  EXPECT_EQ(TTestSurface::NameOf(D->FindNearestItem(S->ItemOf(C), dkRight)), "Over");
  EXPECT_EQ(TTestSurface::NameOf(D->FindNearestItem(S->ItemOf(C), dkUp)), "Over");
  S->Controls.back()->Bounds = Bounds(100, 200, 20, 20);
  S->Controls[2]->Bounds = Bounds(100, 180, 20, 20); // Second now as far below as First above
  S->Controls[1]->Bounds = Bounds(100, 20, 20, 20);
  EXPECT_EQ(TTestSurface::NameOf(D->FindNearestItem(S->ItemOf(C), dkUp)), "First");
  EXPECT_EQ(TTestSurface::NameOf(D->FindNearestItem(S->ItemOf(C), dkLeft)), "nil"); // same centre X
}

TEST_F(NearestTest, BareArrowsWalkCtrlMovesShiftSizes) {
  SelectOnly(Centre);
  Key(dkLeft);
  EXPECT_EQ(Selected(), (std::vector<String>{"Left"}));
  Key(dkRight);
  EXPECT_EQ(Selected(), (std::vector<String>{"Centre"}));
  Key(dkRight, {ssCtrl});
  EXPECT_EQ(Centre->Bounds, Bounds(201, 200, 40, 20));
  D->SetGridSize({8, 4});
  Key(dkDown, {ssCtrl, ssShift});
  Key(dkLeft, {ssCtrl, ssShift});
  EXPECT_EQ(Centre->Bounds, Bounds(193, 204, 40, 20)); // by a cell, not onto the grid
  Key(dkRight, {ssShift});
  Key(dkUp, {ssShift});
  EXPECT_EQ(Centre->Bounds, (TRect{193, 204, 234, 223}));
  Key(dkRight, {ssCtrl}, true); // releases do nothing
  EXPECT_EQ(Centre->Bounds, (TRect{193, 204, 234, 223}));
}

TEST_F(NearestTest, SeveralSelectedMoveTogetherButDoNotWalk) {
  TTestControl* Left = S->Controls[1];
  SelectOnly(Centre);
  D->Select(S->ItemOf(Left), true);
  D->Select(S->ItemOf(S->Controls.back()), true); // Inner, of another parent
  Key(dkDown);
  EXPECT_EQ(Selected(), (std::vector<String>{"Centre", "Left", "Inner"}));
  S->Log.Clear();
  Key(dkDown, {ssCtrl});
  EXPECT_EQ(Selected(), (std::vector<String>{"Centre", "Left"}));
  EXPECT_EQ(Centre->Bounds, Bounds(200, 201, 40, 20));
  EXPECT_EQ(Left->Bounds, Bounds(100, 206, 40, 20));
  EXPECT_EQ(S->Log.Count("Modified"), 1);
}

TEST_F(NearestTest, RootSelectedOrLockedOrRefusedLeavesItemsAlone) {
  D->Select(S->GetRoot(), false);
  Key(dkRight);
  Key(dkRight, {ssCtrl});
  EXPECT_EQ(Selected(), (std::vector<String>{"Form1"}));
  EXPECT_EQ(S->Root->Bounds, (TRect{0, 0, 640, 480}));

  SelectOnly(Centre);
  D->Lock();
  S->Painter->Begins = 0;
  Key(dkRight, {ssShift});
  EXPECT_EQ(Centre->Bounds, Bounds(200, 200, 40, 20));
  EXPECT_EQ(S->Painter->Begins, 2); // the guides are shown all the same (a nested paint)
  D->Unlock();

  S->Refuse = true;
  EXPECT_THROW(Key(dkRight, {ssCtrl}), EComponentDesignerException);
  EXPECT_EQ(Centre->Bounds, Bounds(200, 200, 40, 20));
}

TEST_F(NearestTest, ModifierAloneShowsTheGuidesUntilReleased) {
  TTestControl* Twin = S->AddControl(nullptr, "Twin", Bounds(200, 400, 40, 20)); // same left
  (void)Twin;
  SelectOnly(Centre);
  Key(dkNone, {ssCtrl});
  ASSERT_FALSE(S->Painter->Lines.empty());
  EXPECT_EQ(S->Painter->Lines.front().Rect, (TRect{200, 200, 200, 420}));
  const int Begins = S->Painter->Begins;
  Key(dkNone, {ssCtrl}); // repeat: already on show
  EXPECT_EQ(S->Painter->Begins, Begins);
  Key(dkNone, {}, true);
  EXPECT_TRUE(S->Painter->Lines.empty());
  Key(dkNone, {ssCtrl});
  EXPECT_EQ(S->Painter->Begins, Begins + 2);
  EXPECT_TRUE(D->HorzGuides().empty()); // the lists live only within the call
}

TEST_F(NearestTest, TabFollowsTheSurfacesOrderAndDeleteGoesToTheSurface) {
  SelectOnly(Centre);
  Key(dkTab);
  EXPECT_EQ(Selected(), (std::vector<String>{"Left"}));
  Key(dkTab, {ssShift});
  Key(dkTab, {ssShift});
  EXPECT_EQ(Selected(), (std::vector<String>{"Panel"}));
  Key(dkDelete);
  EXPECT_EQ(S->Log.Count("DeleteSelection"), 1);
  Key(dkEnter);
  Key(dkChar);
  EXPECT_EQ(Selected(), (std::vector<String>{"Panel"}));
}

//===----------------------------------------------------------------------===//
// Escape
//===----------------------------------------------------------------------===//

TEST_F(SurfaceTest, EscapeDuringAMoveCancelsItAndGoesOnWithTheParent) {
  D->SetGuidelines(false);
  TTestControl* Panel = S->AddControl(nullptr, "Panel", Bounds(200, 16, 200, 200), true);
  TTestControl* X = S->AddControl(Panel, "X", Bounds(20, 20, 60, 20));
  Press(X, 230, 46);
  Move(262, 46);
  S->CursorPoint = {262, 46};
  S->Log.Clear();
  Key(dkEscape);
  EXPECT_EQ(Selected(), (std::vector<String>{"Panel"}));
  EXPECT_EQ(D->GetDragAction(), daMove);
  EXPECT_EQ(TTestSurface::NameOf(D->DragParent()), "Form1");
  EXPECT_EQ(S->Log.Count("BeginDrag(Form1,262,46)"), 1);
  Move(278, 46);
  Release(278, 46);
  EXPECT_EQ(Panel->Bounds, Bounds(216, 16, 200, 200));
  EXPECT_EQ(X->Bounds, Bounds(20, 20, 60, 20)); // the cancelled move left it alone
}

TEST_F(SurfaceTest, EscapeWalksUpOrClears) {
  TTestControl* Panel = S->AddControl(nullptr, "Panel", Bounds(200, 16, 200, 200), true);
  TTestControl* Group = S->AddControl(Panel, "Group", Bounds(10, 10, 150, 150), true);
  Group->IsSelectable = false;
  TTestControl* X = S->AddControl(Group, "X", Bounds(20, 20, 60, 20));
  SelectOnly(X);
  Key(dkEscape); // past the unselectable group
  EXPECT_EQ(Selected(), (std::vector<String>{"Panel"}));
  S->Log.Clear();
  Key(dkEscape); // directly in the root: the selection goes
  EXPECT_TRUE(Selected().empty());
  EXPECT_EQ(S->Log.Calls.back(), "AttachHandles(nil)");
  Key(dkEscape); // nothing selected: the same, without effect
  EXPECT_TRUE(Selected().empty());
}

TEST_F(SurfaceTest, EscapeInARubberBandEndsItAndKeepsTheSelection) {
  S->AddControl(nullptr, "A", Bounds(20, 20, 20, 20));
  Press(nullptr, 5, 5);
  Move(100, 100);
  Key(dkEscape);
  EXPECT_EQ(D->GetDragAction(), daNone);
  EXPECT_EQ(Selected(), (std::vector<String>{"Form1"}));
  EXPECT_TRUE(S->Boxes->Visible().empty());
  Release(100, 100);
  EXPECT_EQ(Selected(), (std::vector<String>{"Form1"}));
}
