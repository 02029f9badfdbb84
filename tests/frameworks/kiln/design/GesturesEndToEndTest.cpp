//===- tests/frameworks/kiln/design/GesturesEndToEndTest.cpp - A form built by hand ===//
//
// A form designed through the surface's input only: presses, moves, releases and
// keys, as the design window delivers them.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {
std::vector<String> SelectedNames(TKilnRoot* Root) {
  std::vector<String> Names;
  IPtr<IDesignerSelections> S = Root->GetSelection();
  for (int I = 0; I < S->GetCount(); ++I) Names.push_back(static_cast<TComponent*>(S->Get(I))->Name());
  return Names;
}
TRect BoundsOf(TComponent* C) { return static_cast<TControl*>(C)->BoundsRect(); }
} // namespace

TEST_F(KilnDesignFixture, APanelWithTwoButtonsBuiltMovedSizedAndNudgedByHand) {
  Env->Options.UseDesignerGuidelines = false; // the grid alone, so every step is exact
  IPtr<IRoot> Root = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Root);
  TKilnSurface* S = KilnSurfaceOf(Root);
  TComponent* Form = Root->GetRoot();

  // A panel by a drag on the form: both corners on the grid, the box one larger.
  Arm(TPanel::StaticClass());
  Drag(S, {16, 16}, {216, 112});
  Arm(nullptr);
  auto* Panel = static_cast<TControl*>(Form->FindComponent("Panel1"));
  ASSERT_NE(Panel, nullptr);
  EXPECT_EQ(Panel->BoundsRect(), Rect(16, 16, 217, 113));
  EXPECT_EQ(Panel->Parent(), Form);

  // Two buttons dragged inside the panel, in the panel's coordinates.
  Arm(TButton::StaticClass());
  Drag(S, {40, 40}, {120, 64});
  Drag(S, {40, 80}, {120, 104});
  Arm(nullptr);
  TComponent* Button1 = Form->FindComponent("Button1");
  TComponent* Button2 = Form->FindComponent("Button2");
  ASSERT_TRUE(Button1 && Button2);
  EXPECT_EQ(static_cast<TControl*>(Button1)->Parent(), Panel);
  EXPECT_EQ(static_cast<TControl*>(Button2)->Parent(), Panel);
  EXPECT_EQ(BoundsOf(Button1), Rect(24, 24, 105, 49));
  EXPECT_EQ(BoundsOf(Button2), Rect(24, 64, 105, 89));
  EXPECT_EQ(SelectedNames(Kiln), std::vector<String>{"Button2"});

  // A rubber band inside the panel (Ctrl on the panel) takes both, in surface order.
  Drag(S, {200, 100}, {30, 30}, {ssCtrl});
  EXPECT_EQ(SelectedNames(Kiln), (std::vector<String>{"Button1", "Button2"}));

  // Both move together by a grid step right and down.
  Drag(S, {50, 50}, {66, 58});
  EXPECT_EQ(BoundsOf(Button1), Rect(40, 32, 121, 57));
  EXPECT_EQ(BoundsOf(Button2), Rect(40, 72, 121, 97));

  // The second alone, then sized by its bottom-right handle.
  S->MouseDown(400, 400, {});
  S->MouseUp(400, 400);
  S->MouseDown(70, 100, {});
  S->MouseUp(70, 100);
  EXPECT_EQ(SelectedNames(Kiln), std::vector<String>{"Button2"});
  Drag(S, {137, 113}, {161, 121});
  EXPECT_EQ(BoundsOf(Button2), Rect(40, 72, 145, 105));

  // Nudged a pixel right by the keyboard, then Escape walks up to the panel.
  S->KeyDown(dkRight, {ssCtrl});
  EXPECT_EQ(BoundsOf(Button2), Rect(41, 72, 146, 105));
  S->KeyDown(dkEscape);
  EXPECT_EQ(SelectedNames(Kiln), std::vector<String>{"Panel1"});

  // The tree: the form owns all three; the buttons stand in the panel.
  ASSERT_EQ(Form->ComponentCount(), 3);
  EXPECT_EQ(Form->Components(0), Panel);
  EXPECT_EQ(Form->Components(1), Button1);
  EXPECT_EQ(Form->Components(2), Button2);
  EXPECT_EQ(static_cast<TWinControl*>(static_cast<TControl*>(Panel))->ControlCount(), 2);
  EXPECT_TRUE(Root->GetModifyTime() > 0);
}

TEST_F(KilnDesignFixture, ARefusedChangeLeavesEverythingWhereItWas) {
  Env->Options.UseDesignerGuidelines = false;
  IPtr<TRecordingModule> Module;
  IPtr<IRoot> Root = NewForm("Form1", &Module);
  TKilnRoot* Kiln = KilnRoot(Root);
  TKilnSurface* S = KilnSurfaceOf(Root);
  TComponent* Button = Kiln->CreateComponent(TButton::StaticClass(), Root->GetRoot(), 8, 8, 75, 25);
  Module->ReadOnly = true;
  // The refusal passes out of the gesture to the window, which shows it.
  try {
    Drag(S, {20, 20}, {60, 44}); // a move
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Source is read-only");
  }
  EXPECT_THROW(S->KeyDown(dkRight, {ssCtrl}), EComponentDesignerException); // a nudge
  EXPECT_EQ(BoundsOf(Button), Rect(8, 8, 83, 33));
  Arm(TButton::StaticClass());
  EXPECT_THROW(Drag(S, {200, 200}, {260, 230}), EComponentDesignerException); // a creation
  EXPECT_EQ(Root->GetRoot()->ComponentCount(), 1);
  EXPECT_EQ(Kiln->SurfaceDesigner()->GetDragAction(), daNone); // the engine is idle again

  // Once the host allows it, the same move goes through.
  Module->ReadOnly = false;
  Arm(nullptr);
  Drag(S, {20, 20}, {36, 28});
  EXPECT_EQ(BoundsOf(Button), Rect(24, 16, 99, 41));
}
