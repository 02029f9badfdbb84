//===- tests/frameworks/kiln/design/KilnSurfaceTest.cpp - The Kiln surface ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {
/// A component editor that counts its `Edit` calls.
class TCountingEditor : public TInterfacedObject, public IComponentEditor {
  FK_CLASS(TCountingEditor, TInterfacedObject)
  FK_INTERFACES(IComponentEditor)
  explicit TCountingEditor(TComponent* C = nullptr, std::vector<String>* Edits = nullptr) : FC(C), FEdits(Edits) {}
  void Edit() override { FEdits->push_back(FC->Name()); }
  void ExecuteVerb(int) override {}
  String GetVerb(int) override { return ""; }
  int GetVerbCount() override { return 0; }
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  void Copy() override {}
  bool IsInInlined() override { return false; }
  TComponent* GetComponent() override { return FC; }
  IPtr<IDesigner> GetDesigner() override { return nullptr; }

private:
  TComponent* FC;
  std::vector<String>* FEdits;
};
} // namespace
FK_IMPLEMENT(TCountingEditor, "Tests") {}

struct KilnSurfaceTest : KilnDesignFixture {
  IPtr<IRoot> Root;
  TKilnRoot* Kiln = nullptr;
  TKilnSurface* S = nullptr;
  TControl* Panel = nullptr;
  TControl* Button = nullptr;
  TComponent* Timer = nullptr;
  void SetUp() override {
    KilnDesignFixture::SetUp();
    Env->Options.UseDesignerGuidelines = false;
    Root = NewForm("Form1");
    Kiln = KilnRoot(Root);
    S = KilnSurfaceOf(Root);
    TComponent* Form = Root->GetRoot();
    Panel = static_cast<TControl*>(Kiln->CreateComponent(TPanel::StaticClass(), Form, 16, 16, 200, 100));
    Button = static_cast<TControl*>(Kiln->CreateComponent(TButton::StaticClass(), Panel, 8, 8, 75, 25));
    Timer = Kiln->CreateComponent(TTimer::StaticClass(), Form, 0, 0, 0, 0);
    S->ItemFromComponent(Timer)->SetBoundsRect(Rect(40, 40, 68, 68)); // over the panel
  }
  void TearDown() override {
    TRootHooks::GetComponentEditor = nullptr;
    Root = nullptr;
    KilnDesignFixture::TearDown();
  }
  TComponent* At(int X, int Y) { return ExtractComponent(S->ItemAtPoint(X, Y)); }
};

TEST_F(KilnSurfaceTest, IconsLieAboveControlsAndTheDeepestControlWins) {
  EXPECT_EQ(At(50, 50), Timer);             // the icon covers the button there
  EXPECT_EQ(At(30, 30), Button);            // (8, 8) in the panel
  EXPECT_EQ(At(150, 90), Panel);
  EXPECT_EQ(At(400, 400), Root->GetRoot()); // nothing: the form
  EXPECT_EQ(Timer->DesignInfo(), 40 | (40 << 16));
  // Icons keep negative positions through the packed design position.
  S->ItemFromComponent(Timer)->SetBoundsRect(Rect(-4, -12, 24, 16));
  EXPECT_EQ(S->ItemFromComponent(Timer)->GetBoundsRect(), Rect(-4, -12, 24, 16));
  // Points convert by the offsets of the parents.
  IPtr<IItem> ButtonItem = S->ItemFromComponent(Button);
  EXPECT_EQ(ButtonItem->LocalToGlobal({0, 0}), Panel->ClientToParent({8, 8}, static_cast<TWinControl*>(Root->GetRoot())));
  EXPECT_EQ(ButtonItem->GlobalToLocal(ButtonItem->LocalToGlobal({5, 6})), Point(5, 6));
  EXPECT_TRUE(S->ItemFromComponent(Panel)->Contains(ButtonItem));
  EXPECT_FALSE(ButtonItem->Contains(S->ItemFromComponent(Panel)));
}

TEST_F(KilnSurfaceTest, TabWalksTheComponentsAndTheSelectionHidesWhatIsInsideIt) {
  Kiln->Select(Panel, false);
  S->KeyDown(dkTab);
  EXPECT_EQ(Kiln->SelectedComponent(), Button);
  S->KeyDown(dkTab);
  EXPECT_EQ(Kiln->SelectedComponent(), Timer);
  S->KeyDown(dkTab);
  EXPECT_EQ(Kiln->SelectedComponent(), Panel); // round again
  S->KeyDown(dkTab, {ssShift});
  EXPECT_EQ(Kiln->SelectedComponent(), Timer);
  // With the panel selected, the button inside it counts as selected; the form does not.
  Kiln->Select(Panel, false);
  IPtr<ISelections> Items = Kiln->SelectionItems();
  EXPECT_TRUE(S->ItemInSelections(Items, S->ItemFromComponent(Button)));
  EXPECT_FALSE(S->ItemInSelections(Items, S->ItemFromComponent(Timer)));
  EXPECT_FALSE(S->ItemInSelections(Items, S->GetRoot()));
}

TEST_F(KilnSurfaceTest, ADoubleClickEditsThroughTheComponentEditor) {
  std::vector<String> Edits;
  TRootHooks::GetComponentEditor = [&](TComponent* C, const IPtr<IDesigner>&) {
    return NewAs<IComponentEditor, TCountingEditor>(C, &Edits);
  };
  // One item selected (the timer): the button is edited and the selection stays.
  S->MouseDown(30, 30, {}, true);
  S->MouseUp(30, 30);
  EXPECT_EQ(Edits, std::vector<String>{"Button1"});
  EXPECT_EQ(Kiln->SelectedComponent(), Timer);
  // Several selected, the button not among them: it is selected, then edited.
  Kiln->Select(Panel, false);
  Kiln->Select(Timer, true);
  S->MouseDown(30, 30, {}, true);
  S->MouseUp(30, 30);
  EXPECT_EQ(Edits, (std::vector<String>{"Button1", "Button1"}));
  EXPECT_EQ(Kiln->SelectedComponent(), Button);
  Kiln->Edit(Panel); // not selected: no item of the selection to edit
  Kiln->Select(Panel, false);
  Kiln->Edit(Panel);
  EXPECT_EQ(Edits, (std::vector<String>{"Button1", "Button1", "Panel1"}));
}

TEST_F(KilnDesignFixture, AnEmptyModuleHasNothingToWalkOrHit) {
  IPtr<IRoot> Root = NewForm("Form1");
  TKilnSurface* S = KilnSurfaceOf(Root);
  EXPECT_EQ(S->GetItemsCount(), 0);
  EXPECT_EQ(S->FindNextItem(nullptr, true), nullptr);
  S->KeyDown(dkTab); // nothing to select: the root stays the selection
  EXPECT_EQ(KilnRoot(Root)->GetSelection()->Get(0), Root->GetRoot());
  EXPECT_EQ(ExtractComponent(S->ItemAtPoint(5, 5)), Root->GetRoot());
  EXPECT_TRUE(S->GetGrabHandles()->HandleAtPoint(5, 5).Empty());
  EXPECT_EQ(S->GetRoot()->GetBoundsRect(), Rect(0, 0, 640, 480)); // a new form's client area
  EXPECT_EQ(S->GetRoot()->GetParent(), nullptr);
}
