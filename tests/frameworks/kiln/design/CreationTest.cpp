//===- tests/frameworks/kiln/design/CreationTest.cpp - Where new components land ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A control with no size of its own.
class TZeroControl : public TControl {
  FK_CLASS(TZeroControl, TControl)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    SetBounds(Left(), Top(), 0, 0);
  }
};

TRect BoundsOf(TComponent* C) { return static_cast<TControl*>(C)->BoundsRect(); }

/// A non-visual component whose class does not support inheritance.
class TLoneTimer : public TTimer {
  FK_CLASS(TLoneTimer, TTimer)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    SetComponentStyle(ComponentStyle().Exclude(csInheritable));
  }
};

/// The update manager of a module whose family the test decides.
class TFamilyManager : public TInterfacedObject, public IUpdateManager {
  FK_CLASS(TFamilyManager, TInterfacedObject)
  FK_INTERFACES(IUpdateManager)
  bool GetHasDescendents() override {
    ++Asked;
    return HasDescendents;
  }
  bool HasDescendents = false;
  int Asked = 0;
};

} // namespace

FK_IMPLEMENT(TZeroControl, "Tests") {}
FK_IMPLEMENT(TLoneTimer, "Tests") {}
FK_IMPLEMENT(TFamilyManager, "Tests") {}

struct CreationTest : KilnDesignFixture {
  IPtr<IRoot> Root;
  TKilnRoot* Kiln = nullptr;
  TComponent* Form = nullptr;
  void SetUp() override {
    KilnDesignFixture::SetUp();
    Root = NewForm("Form1");
    Kiln = KilnRoot(Root);
    Form = Root->GetRoot();
  }
  void TearDown() override {
    Root = nullptr;
    ControlPPIHook = nullptr;
    KilnDesignFixture::TearDown();
  }
  IPtr<IInternalPaletteItem> Tool(TClass Class) { return NewAs<IInternalPaletteItem, TToolItem>(Class); }
};

TEST_F(CreationTest, AtNoPlaceTheCentreOfTheParentThenTheCascade) {
  Kiln->CreateComponent(Tool(TButton::StaticClass()));
  Kiln->CreateComponent(Tool(TButton::StaticClass()));
  // 640 by 480: the centre less half of 75 by 25, on the grid of 8; the second meets the
  // first exactly and moves on by 10 each way before the grid.
  EXPECT_EQ(BoundsOf(Form->FindComponent("Button1")), Rect(280, 232, 355, 257));
  EXPECT_EQ(BoundsOf(Form->FindComponent("Button2")), Rect(288, 240, 363, 265));
  // The new component is the selection, and the module was told of each.
  EXPECT_EQ(Kiln->SelectedComponent(), Form->FindComponent("Button2"));
  EXPECT_EQ(Log.Count("Modified"), 2);
}

TEST_F(CreationTest, AClickGivesTheClassItsOwnSizeOrTheFallback) {
  Kiln->CreateComponentPos(Tool(TButton::StaticClass()), 100, 100); // toward zero on the grid
  EXPECT_EQ(BoundsOf(Form->FindComponent("Button1")), Rect(96, 96, 171, 121));
  Kiln->CreateComponentPos(Tool(TZeroControl::StaticClass()), 300, 100);
  // 100 wide, and the bottom grows by 40 from the 1-pixel click: 41 high.
  EXPECT_EQ(BoundsOf(Form->FindComponent("ZeroControl1")), Rect(296, 96, 396, 137));
  Env->Options.SnapToGrid = false;
  Kiln->CreateComponentPos(Tool(TButton::StaticClass()), 101, 299);
  EXPECT_EQ(BoundsOf(Form->FindComponent("Button2")), Rect(101, 299, 176, 324));
}

TEST_F(CreationTest, ThePointPicksTheParentAndIconsGoToTheTop) {
  TComponent* Panel = Kiln->CreateComponent(TPanel::StaticClass(), Form, 16, 16, 200, 100);
  EXPECT_EQ(BoundsOf(Panel), Rect(16, 16, 216, 116));
  Kiln->CreateComponentPos(Tool(TButton::StaticClass()), 50, 50);
  auto* Button = static_cast<TControl*>(Form->FindComponent("Button1"));
  EXPECT_EQ(Button->Parent(), Panel);
  EXPECT_EQ(Button->Owner(), Form);
  EXPECT_EQ(Button->BoundsRect(), Rect(32, 32, 107, 57)); // (34, 34) in the panel, toward zero
  // A non-visual component dropped in the panel stands on the form, in its coordinates.
  Kiln->CreateComponentPos(Tool(TTimer::StaticClass()), 100, 90);
  TComponent* Timer = Form->FindComponent("Timer1");
  ASSERT_NE(Timer, nullptr);
  IPtr<IItem> Icon = Kiln->Surface()->ItemFromComponent(Timer);
  EXPECT_EQ(Icon->GetBoundsRect(), Rect(96, 88, 124, 116));
  EXPECT_TRUE(SameItem(Icon->GetParent(), Kiln->Surface()->GetRoot()));
}

TEST_F(CreationTest, AnotherResolutionScalesWhatIsDraggedOrKeepsIt) {
  ControlPPIHook = [](const TControl*) { return 144; };
  Arm(TButton::StaticClass());
  Kiln->CreateCurrentComponentScaled(Form, Rect(100, 100, 250, 250), false);
  EXPECT_EQ(BoundsOf(Form->FindComponent("Button1")), Rect(67, 67, 167, 167));
  Kiln->CreateCurrentComponentScaled(Form, Rect(100, 100, 250, 250), true);
  EXPECT_EQ(BoundsOf(Form->FindComponent("Button2")), Rect(67, 67, 217, 217));
  EXPECT_EQ(Log.Count("ToolUsed"), 2);
}

TEST_F(CreationTest, NothingIsMadeWithoutAUsableTool) {
  EXPECT_EQ(Kiln->CreateCurrentComponent(Form, Rect(8, 8, 9, 9)), nullptr); // none armed
  auto Disabled = New<TToolItem>(TButton::StaticClass());
  Disabled->Enabled = false;
  EXPECT_EQ(Kiln->DoCreateComponent(InterfaceOf<IInternalPaletteItem>(Disabled.Get()), nullptr, Rect(8, 8, 9, 9),
                                    true, true),
            nullptr);
  EXPECT_EQ(Form->ComponentCount(), 0);
  // A class that keeps its own bounds.
  TComponent* Child = Kiln->CreateChild(TCheckBox::StaticClass(), Form);
  EXPECT_EQ(BoundsOf(Child), Rect(0, 0, 97, 19));
  EXPECT_EQ(Child->Name(), "CheckBox1");
}

TEST_F(CreationTest, ADataModuleRefusesControls) {
  IPtr<TRecordingModule> Module = New<TRecordingModule>("Data1.kfm", &Log);
  IPtr<IRoot> Data = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Data1.kfm", false, "Data1",
                                          "DataModule", "", nullptr, "");
  Open.push_back(Data);
  TKilnRoot* DataRoot = KilnRoot(Data);
  DataRoot->CreateComponentPos(Tool(TTimer::StaticClass()), 40, 40);
  EXPECT_NE(Data->GetRoot()->FindComponent("Timer1"), nullptr);
  try {
    DataRoot->CreateComponentPos(Tool(TButton::StaticClass()), 80, 80);
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Controls cannot be added to a data module (TButton)");
  }
  EXPECT_EQ(Data->GetRoot()->ComponentCount(), 1); // the refused button is gone
}

TEST_F(CreationTest, AClassWithoutInheritanceIsRefusedOnlyWhileTheModuleHasDescendants) {
  IPtr<TFamilyManager> Family = New<TFamilyManager>();
  auto Saved = TRootHooks::CreateUpdateManager;
  TRootHooks::CreateUpdateManager = [&](TComponentRoot&, TComponent*, TComponent*, const IPtr<IUpdateManager>&) {
    return InterfaceOf<IUpdateManager>(Family.Get());
  };
  auto Restore = Finally([&]() noexcept { std::swap(TRootHooks::CreateUpdateManager, Saved); });
  IPtr<IRoot> Managed = NewForm("Form2");
  TKilnRoot* Root = KilnRoot(Managed);
  TComponent* Form2 = Managed->GetRoot();
  ASSERT_EQ(QueryAs<IInternalRoot>(Managed)->GetUpdateManager().Get(), static_cast<IUpdateManager*>(Family.Get()));

  // A module with an update manager but no descendant takes the class.
  Root->CreateComponentPos(Tool(TLoneTimer::StaticClass()), 40, 40);
  EXPECT_NE(Form2->FindComponent("LoneTimer1"), nullptr);
  EXPECT_GE(Family->Asked, 1);

  // Once a descendant is open, the class is refused and the new component freed; the
  // module is not modified and the selection stays.
  Family->HasDescendents = true;
  int Modifications = Log.Count("Modified");
  try {
    Root->CreateComponentPos(Tool(TLoneTimer::StaticClass()), 80, 80);
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Component class 'TLoneTimer' does not support inheritance and cannot be added to a "
                           "module that has descendents");
  }
  EXPECT_EQ(Form2->ComponentCount(), 1);
  EXPECT_EQ(Log.Count("Modified"), Modifications);
  EXPECT_EQ(Root->SelectedComponent(), Form2->FindComponent("LoneTimer1"));
  // A class that supports inheritance is still welcome.
  Root->CreateComponentPos(Tool(TTimer::StaticClass()), 120, 120);
  EXPECT_NE(Form2->FindComponent("Timer1"), nullptr);
}
