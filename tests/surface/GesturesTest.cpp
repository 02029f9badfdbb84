//===- tests/surface/GesturesTest.cpp - Presses, drags and their outcomes -===//
#include "tests/surface/SurfaceFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// Grid gestures without guides: a button on the form and a panel with a border.
class GridGestureTest : public SurfaceTest {
protected:
  void SetUp() override {
    SurfaceTest::SetUp();
    D->SetGuidelines(false);
    Button = S->AddControl(nullptr, "Button1", Bounds(16, 16, 75, 25));
    Panel = S->AddControl(nullptr, "Panel1", Bounds(200, 16, 200, 200), true);
    Panel->ClientOffset = {2, 2};
    Edit = S->AddControl(Panel, "Edit1", Bounds(10, 10, 100, 21));
  }
  TTestControl *Button = nullptr, *Panel = nullptr, *Edit = nullptr;
};

} // namespace

//===----------------------------------------------------------------------===//
// Moving
//===----------------------------------------------------------------------===//

TEST_F(GridGestureTest, ClickWithoutMotionChangesNothing) {
  Press(Button, 20, 20);
  EXPECT_EQ(D->GetDragAction(), daMove);
  EXPECT_EQ(D->DragRect(), (TRect{0, 0, 0, 0}));
  S->Log.Clear();
  Release(20, 20);
  EXPECT_EQ(Button->Bounds, Bounds(16, 16, 75, 25));
  EXPECT_EQ(S->Log.Count("Modified"), 0);
  EXPECT_EQ(S->Log.Count("SetBounds"), 0);
  EXPECT_EQ(S->Log.Calls, (std::vector<String>{"AttachHandles(Button1)"}));
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1"}));
  EXPECT_EQ(D->GetDragAction(), daNone);
}

TEST_F(GridGestureTest, MoveRoundsTheDeltaToTheNearestGridStep) {
  struct TCase { int DX, DY; TRect Expected; };
  const TCase Cases[] = {
      {3, 0, Bounds(16, 16, 75, 25)},   // rounds to 0: no move at all
      {4, 0, Bounds(24, 16, 75, 25)},   // ties go up
      {-4, 0, Bounds(16, 16, 75, 25)},  // -4 rounds to 0
      {-5, 0, Bounds(8, 16, 75, 25)},   // -5 rounds to -8
      {40, 25, Bounds(56, 40, 75, 25)}, // 40 stays, 25 rounds to 24
  };
  for (const TCase& C : Cases) {
    Button->Bounds = Bounds(16, 16, 75, 25);
    Press(Button, 20, 20);
    Move(20 + C.DX, 20 + C.DY);
    Release(0, 0); // the point of the release is not used
    EXPECT_EQ(Button->Bounds, C.Expected) << C.DX << "," << C.DY;
  }
}

TEST_F(GridGestureTest, MoveKeepsAnOffGridItemsDistanceFromTheGrid) {
  Button->Bounds = Bounds(13, 13, 75, 25);
  S->Origin = {3, 3}; // the origin plays no part in a move
  S->Log.Clear();
  Drag(Button, {20, 20}, {29, 20});
  EXPECT_EQ(Button->Bounds, Bounds(21, 13, 75, 25));
  EXPECT_EQ(S->Log.Count("Modified"), 1);
}

TEST_F(GridGestureTest, MoveWithTheGridOffFollowsThePointer) {
  D->SetGridAligned(false);
  Drag(Button, {20, 20}, {23, 19});
  EXPECT_EQ(Button->Bounds, Bounds(19, 15, 75, 25));
  D->SetGridAligned(true);
  S->GridDisabled = true;
  Drag(Button, {20, 20}, {21, 21});
  EXPECT_EQ(Button->Bounds, Bounds(20, 16, 75, 25));
}

TEST_F(GridGestureTest, PressOnASelectedItemMakesItTheAnchorAndMovesAll) {
  TTestControl* Label = S->AddControl(nullptr, "Label1", Bounds(16, 60, 40, 13));
  TTestControl* Check = S->AddControl(nullptr, "Check1", Bounds(16, 90, 40, 17));
  Press(Button, 20, 20);
  Release(20, 20);
  Press(Label, 20, 62, {ssShift});
  Press(Check, 20, 92, {ssShift});
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1", "Label1", "Check1"}));
  EXPECT_EQ(D->GetDragAction(), daNone); // Shift toggles without a drag
  Press(Check, 20, 92);
  // The pressed item comes first, the others follow in reversed order.
  EXPECT_EQ(Selected(), (std::vector<String>{"Check1", "Label1", "Button1"}));
  Move(36, 92);
  Release(36, 92);
  EXPECT_EQ(Button->Bounds, Bounds(32, 16, 75, 25));
  EXPECT_EQ(Label->Bounds, Bounds(32, 60, 40, 13));
  EXPECT_EQ(Check->Bounds, Bounds(32, 90, 40, 17));
}

TEST_F(GridGestureTest, PressCutsTheSelectionToTheItemsParent) {
  D->Select(S->ItemOf(Button), false);
  D->Select(S->ItemOf(Edit), true);
  D->Select(S->ItemOf(Panel), true);
  Press(Button, 20, 20);
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1", "Panel1"}));
  EXPECT_EQ(TTestSurface::NameOf(D->DragParent()), "Form1");
  // Locked: the selection keeps other parents, and nothing moves.
  Release(20, 20);
  D->Select(S->ItemOf(Edit), true);
  D->Lock();
  Press(Button, 20, 20);
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1", "Panel1", "Edit1"}));
  EXPECT_EQ(D->GetDragAction(), daNone);
  Move(60, 60);
  Release(60, 60);
  EXPECT_EQ(Button->Bounds, Bounds(16, 16, 75, 25));
}

TEST_F(GridGestureTest, MoveDrawsOneBoxPerSelectedItemAndErasesThemAll) {
  D->Select(S->ItemOf(Button), false);
  D->Select(S->ItemOf(Panel), true);
  Press(Button, 20, 20);
  IPtr<TTestDragBoxes> Boxes = S->Boxes;
  EXPECT_EQ(Boxes->Used(), 2);
  Move(28, 20);
  EXPECT_EQ(Boxes->Visible(), (std::vector<TRect>{Bounds(24, 16, 75, 25), Bounds(208, 16, 200, 200)}));
  Release(28, 20);
  EXPECT_TRUE(Boxes->Visible().empty()); // every box drawn an even number of times
  EXPECT_EQ(Boxes->Used(), 0);
}

//===----------------------------------------------------------------------===//
// Sizing
//===----------------------------------------------------------------------===//

TEST_F(GridGestureTest, SizingFromEachKindOfHandle) {
  struct TCase { TMoveAffects Affects; TPoint From, To; TRect Expected; };
  const TRect Start{16, 16, 91, 41};
  const TCase Cases[] = {
      {{gaRight, gaBottom}, {91, 41}, {110, 50}, {16, 16, 113, 49}}, // corner: onto the lines
      {{gaRight}, {91, 30}, {93, 30}, {16, 16, 91, 41}},             // 2 < distance 4: stays
      {{gaRight}, {91, 30}, {96, 30}, {16, 16, 97, 41}},             // 5 > distance 1: jumps
      {{gaLeft}, {16, 30}, {5, 30}, {8, 16, 91, 41}},
      {{gaTop}, {50, 16}, {50, 13}, {16, 16, 91, 41}},               // already on a line
      {{gaTop}, {50, 16}, {50, 10}, {16, 8, 91, 41}},
      {{gaLeft, gaTop}, {16, 16}, {5, 10}, {8, 8, 91, 41}},
      {{gaBottom}, {50, 41}, {50, 61}, {16, 16, 91, 65}},
      {{gaLeft}, {16, 30}, {120, 30}, {91, 16, 120, 41}},            // past the other edge
  };
  for (const TCase& C : Cases) {
    Button->Bounds = Start;
    SelectOnly(Button);
    Press(Button, C.From.X, C.From.Y, {}, C.Affects);
    EXPECT_EQ(D->GetDragAction(), daSize);
    Move(C.To.X, C.To.Y);
    Release(C.To.X, C.To.Y);
    EXPECT_EQ(Button->Bounds, C.Expected) << C.To.X << "," << C.To.Y;
  }
}

TEST_F(GridGestureTest, SizingSnapsThroughTheOrigin) {
  S->Origin = {3, 3};
  SelectOnly(Button);
  Drag(Button, {91, 30}, {111, 30}, {}, {gaRight});
  EXPECT_EQ(Button->Bounds, (TRect{16, 16, 108, 41})); // last column 107 = 3 + 13 * 8
}

TEST_F(GridGestureTest, SizeThatEndsWhereItBeganIsNoChange) {
  SelectOnly(Button);
  Press(Button, 91, 41, {}, {gaRight, gaBottom});
  EXPECT_EQ(S->Boxes->Visible(), (std::vector<TRect>{TRect{16, 16, 91, 41}}));
  S->Log.Clear();
  Move(93, 42);
  Release(93, 42);
  EXPECT_EQ(Button->Bounds, (TRect{16, 16, 91, 41}));
  EXPECT_EQ(S->Log.Count("Modified"), 0);
}

TEST_F(GridGestureTest, HandlePressesThatDoNotSize) {
  SelectOnly(Button);
  D->Lock();
  S->Log.Clear();
  Press(Button, 91, 41, {}, {gaRight, gaBottom});
  EXPECT_EQ(D->GetDragAction(), daNone);
  EXPECT_EQ(S->Log.Calls, (std::vector<String>{"FocusSurface"})); // silent: no selection change
  D->Unlock();
  Press(Button, 91, 41, {ssShift}, {gaRight, gaBottom}); // Shift toggles instead
  EXPECT_EQ(D->GetDragAction(), daNone);
  EXPECT_TRUE(Selected().empty());
  // All four edges from a handle is a move.
  SelectOnly(Button);
  Press(Button, 91, 41, {}, AllMoveAffects);
  EXPECT_EQ(D->GetDragAction(), daMove);
  D->CancelDragging();
  // With several selected, a size draws no box and changes nothing.
  D->Select(S->ItemOf(Panel), true);
  Press(Button, 91, 41, {}, {gaRight});
  EXPECT_EQ(S->Boxes->Used(), 0);
  Move(140, 41);
  Release(140, 41);
  EXPECT_EQ(Button->Bounds, Bounds(16, 16, 75, 25));
}

//===----------------------------------------------------------------------===//
// Creating
//===----------------------------------------------------------------------===//

TEST_F(GridGestureTest, CreateByClickIsOneByOneAtTheGridPoint) {
  Tools->Armed = true;
  S->Log.Clear();
  Press(nullptr, 21, 21);
  EXPECT_EQ(D->GetDragAction(), daCreate);
  Release(21, 21);
  EXPECT_EQ(S->Log.Count("CreateItem(Form1,24,24,25,25,scaled)"), 1);
  EXPECT_EQ(Selected(), (std::vector<String>{"Control4"}));
  EXPECT_EQ(S->Controls.back()->Bounds, (TRect{24, 24, 25, 25}));
}

TEST_F(GridGestureTest, CreateByDragInEveryDirection) {
  Tools->Armed = true;
  const std::pair<TPoint, TPoint> Drags[] = {
      {{21, 21}, {60, 45}}, {{60, 45}, {21, 21}}, {{21, 45}, {60, 21}}, {{60, 21}, {21, 45}}};
  for (const auto& [From, To] : Drags) {
    S->Log.Clear();
    Drag(nullptr, From, To);
    EXPECT_EQ(S->Log.Count("CreateItem(Form1,24,24,65,49,sized)"), 1) << From.X << "," << From.Y;
  }
  EXPECT_EQ(DragChangeCounter(), 0);
}

TEST_F(GridGestureTest, CreateInsideAContainerUsesItsClientCoordinates) {
  Tools->Armed = true;
  S->Scroll = {10, 0}; // surface x 221 is global x 231
  S->Log.Clear();
  Press(Edit, 221, 39); // the edit is no container: the panel takes the new control
  Release(221, 39);
  EXPECT_EQ(S->Log.Count("CreateItem(Panel1,32,24,33,25,scaled)"), 1);
  EXPECT_EQ(S->Log.Count("BeginDrag(Panel1,221,39)"), 1);
}

TEST_F(GridGestureTest, RightButtonOrNoDragCancelsTheCreation) {
  Tools->Armed = true;
  S->Log.Clear();
  Press(nullptr, 21, 21, {ssRight});
  EXPECT_EQ(D->GetDragAction(), daNone);
  EXPECT_EQ(S->Log.Count("ShowContextMenu"), 1);
  Press(nullptr, 21, 21, {}, {}, false, true);
  EXPECT_EQ(D->GetDragAction(), daNone); // NoDrag: with the tool armed it selects the root
  Release(21, 21);
  EXPECT_EQ(S->Log.Count("CreateItem"), 0);
}

//===----------------------------------------------------------------------===//
// Rubber band
//===----------------------------------------------------------------------===//

TEST_F(GridGestureTest, RubberBandSelectsWhatItTouchesInSurfaceOrder) {
  S->AddControl(nullptr, "Touched", Bounds(100, 45, 20, 20));
  S->AddControl(nullptr, "Missed", Bounds(101, 51, 20, 20));
  TTestControl* Hidden = S->AddControl(nullptr, "Hidden", Bounds(30, 30, 10, 10));
  Hidden->IsDragSelectable = false;
  Press(nullptr, 100, 50); // from the bottom right up to the top left
  EXPECT_EQ(D->GetDragAction(), daSelect);
  EXPECT_EQ(Selected(), (std::vector<String>{"Form1"}));
  Move(5, 5);
  EXPECT_EQ(D->DragRect(), (TRect{5, 5, 100, 50})); // no grid, nothing added
  Release(5, 5);
  // The band's right and bottom edges take what they touch; the panel's child is not
  // of the band's parent.
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1", "Touched"}));
}

TEST_F(GridGestureTest, RubberBandOverNothingLeavesTheRootSelected) {
  SelectOnly(Button);
  Drag(nullptr, {300, 300}, {310, 310});
  EXPECT_EQ(Selected(), (std::vector<String>{"Form1"}));
  // With Shift the root is not selected, but the first hit still replaces the selection.
  SelectOnly(Panel);
  Drag(nullptr, {5, 5}, {40, 40}, {ssShift});
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1"}));
}

TEST_F(GridGestureTest, CtrlBandRunsInsideTheContainer) {
  TTestControl* Memo = S->AddControl(Panel, "Memo1", Bounds(10, 100, 50, 50));
  (void)Memo;
  Press(Panel, 205, 21, {ssCtrl});
  EXPECT_EQ(TTestSurface::NameOf(D->DragParent()), "Panel1");
  Move(230, 150);
  EXPECT_EQ(D->DragRect(), (TRect{3, 3, 28, 132})); // in the panel's client coordinates
  Release(230, 150);
  EXPECT_EQ(Selected(), (std::vector<String>{"Edit1", "Memo1"}));
}

TEST_F(GridGestureTest, RubberBandBoxIsChangedAndErased) {
  Press(nullptr, 300, 300);
  IPtr<TTestDragBoxes> Boxes = S->Boxes;
  Move(320, 310);
  EXPECT_EQ(Boxes->Visible(), (std::vector<TRect>{TRect{300, 300, 320, 310}}));
  Release(320, 310);
  EXPECT_EQ(Boxes->Draws, (std::vector<String>{"Draw(300,300,300,300,band)", "Draw(300,300,300,300,band)",
                                               "Draw(300,300,320,310,band)", "Draw(300,300,320,310,band)"}));
}

//===----------------------------------------------------------------------===//
// Other presses
//===----------------------------------------------------------------------===//

TEST_F(GridGestureTest, DoubleClickEdits) {
  Press(Button, 20, 20, {}, {}, true);
  EXPECT_EQ(Button->Edits, 1);
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1"}));
  EXPECT_EQ(D->GetDragAction(), daNone);
  // With exactly one selected, another item is edited as it stands.
  Press(Panel, 250, 100, {}, {}, true);
  EXPECT_EQ(Panel->Edits, 1);
  EXPECT_EQ(Selected(), (std::vector<String>{"Button1"}));
  // With several selected, an unselected item is selected first, then edited.
  D->Select(S->ItemOf(Edit), true);
  Press(Panel, 250, 100, {}, {}, true);
  EXPECT_EQ(Panel->Edits, 2);
  EXPECT_EQ(Selected(), (std::vector<String>{"Panel1"}));
  // The root is selected first, then edited.
  Press(nullptr, 500, 400, {}, {}, true);
  EXPECT_EQ(S->Root->Edits, 1);
  EXPECT_EQ(Selected(), (std::vector<String>{"Form1"}));
}

TEST_F(GridGestureTest, UnselectableItemsPassThePressToTheirParent) {
  Edit->IsSelectable = false;
  Press(Edit, 220, 30);
  EXPECT_EQ(Selected(), (std::vector<String>{"Panel1"}));
  Release(220, 30);
}

TEST_F(GridGestureTest, NewPressCancelsAnOpenDrag) {
  Press(Button, 20, 20);
  Move(60, 20);
  IPtr<TTestDragBoxes> First = S->Boxes;
  Press(Panel, 250, 100);
  // Told of the cancel before the boxes went off.
  EXPECT_EQ(First->Draws[First->Draws.size() - 2], "CancelDrag");
  EXPECT_EQ(First->Draws.back(), "Draw(56,16,131,41,item)");
  EXPECT_TRUE(First->Visible().empty());
  Release(250, 100);
  EXPECT_EQ(Button->Bounds, Bounds(16, 16, 75, 25));
  D->CancelDragging(); // nothing runs: nothing happens
  EXPECT_EQ(D->GetDragAction(), daNone);
}

//===----------------------------------------------------------------------===//
// Refusal
//===----------------------------------------------------------------------===//

TEST_F(GridGestureTest, RefusedModificationLeavesEveryItemWhereItWas) {
  S->Refuse = true;
  Press(Button, 20, 20);
  D->Select(S->ItemOf(Panel), true);
  Move(60, 60);
  EXPECT_THROW(Release(60, 60), EComponentDesignerException);
  EXPECT_EQ(Button->Bounds, Bounds(16, 16, 75, 25));
  EXPECT_EQ(Panel->Bounds, Bounds(200, 16, 200, 200));
  EXPECT_EQ(D->GetDragAction(), daNone);
  EXPECT_EQ(D->GetSelections()->GetSelectionLevel(), 0);

  SelectOnly(Button);
  Press(Button, 91, 41, {}, {gaRight, gaBottom});
  Move(140, 80);
  EXPECT_THROW(Release(140, 80), EComponentDesignerException);
  EXPECT_EQ(Button->Bounds, Bounds(16, 16, 75, 25));

  Tools->Armed = true;
  const size_t Count = S->Controls.size();
  Press(nullptr, 300, 300);
  EXPECT_THROW(Release(300, 300), EComponentDesignerException);
  EXPECT_EQ(S->Controls.size(), Count);
  EXPECT_EQ(S->Log.Count("SetBounds"), 0);
  EXPECT_EQ(S->Log.Count("Modified"), 0);
}

TEST_F(GridGestureTest, BadGridSizeIsRefused) {
  EXPECT_THROW(D->SetGridSize({0, 8}), EArgumentOutOfRangeException);
  EXPECT_EQ(D->GetGridSize(), (TPoint{8, 8}));
  D->SetGridSize({10, 4});
  EXPECT_EQ(D->PointToGrid({14, 14}, false), (TPoint{10, 16}));
}
