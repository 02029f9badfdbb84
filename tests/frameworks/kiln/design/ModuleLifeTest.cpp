//===- tests/frameworks/kiln/design/ModuleLifeTest.cpp - A module's life on design ===//
#include "core/DesignNotifications.h"
#include "core/EditorGroups.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// Hears what every design surface tells its listeners.
class TWatcher : public TInterfacedObject, public IDesignNotification {
  FK_CLASS(TWatcher, TInterfacedObject)
  FK_INTERFACES(IDesignNotification)
  explicit TWatcher(TCallLog* Log = nullptr) : Log(Log) {}
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent* Item) override { Log->Add("L.ItemDeleted(" + Name(Item) + ")"); }
  void ItemInserted(const IPtr<IDesigner>&, TPersistent* Item) override { Log->Add("L.ItemInserted(" + Name(Item) + ")"); }
  void ItemsModified(const IPtr<IDesigner>&) override { Log->Add("L.ItemsModified"); }
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>& S) override {
    Log->Add("L.SelectionChanged(" + std::to_string(S->GetCount()) + ")");
  }
  void DesignerOpened(const IPtr<IDesigner>& D, bool) override { Log->Add("L.DesignerOpened(" + D->GetRoot()->Name() + ")"); }
  void DesignerClosed(const IPtr<IDesigner>&, bool) override { Log->Add("L.DesignerClosed"); }
  static String Name(TPersistent* P) {
    auto* C = dynamic_cast<TComponent*>(P);
    return C ? C->ClassName() : String("?");
  }
  TCallLog* Log;
};

/// A form that cannot be built.
class TBrokenForm : public TForm {
  FK_CLASS(TBrokenForm, TForm)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    throw EComponentError("the form cannot be built");
  }
};

} // namespace

FK_IMPLEMENT(TWatcher, "Tests") {}
FK_IMPLEMENT(TBrokenForm, "Tests") {}

TEST_F(KilnDesignFixture, AModuleLivesFromCreationToClose) {
  auto Watcher = New<TWatcher>(&Log);
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(Watcher.Get()));
  IPtr<TRecordingModule> Module;
  IPtr<IRoot> Root = NewForm("Form1", &Module);
  TKilnRoot* Kiln = KilnRoot(Root);

  // Created: in the designer's list, its form named and on design, the host and the
  // listeners told.
  EXPECT_EQ(Designer->GetRootsCount(), 1);
  EXPECT_EQ(Root->GetRootName(), "Form1");
  TComponent* Form = Root->GetRoot();
  EXPECT_EQ(Form->ClassName(), "TForm1"); // the module's own class, on the framework's
  EXPECT_EQ(Form->ClassType()->Parent, TForm::StaticClass());
  EXPECT_TRUE(Form->ComponentState().Contains(csDesigning));
  EXPECT_TRUE(Form->ComponentState().Contains(csDesignInstance));
  EXPECT_EQ(static_cast<TControl*>(Form)->Caption(), "Form1");
  EXPECT_EQ(QueryAs<IDesigner>(FindRootDesigner(Form)).Get(), QueryAs<IDesigner>(Root).Get());
  EXPECT_EQ(Log.Count("L.DesignerOpened(Form1)"), 1);

  // Shown and hidden: the form is its own design window.
  Root->Show();
  EXPECT_TRUE(Kiln->DesignWindow()->Visible());
  Root->Hide();
  EXPECT_FALSE(Kiln->DesignWindow()->Visible());

  // Modified: a new time stamp; the host's module, then the listeners.
  int Before = Root->GetModifyTime();
  Log.Clear();
  QueryAs<IDesigner>(Root)->Modified();
  EXPECT_GT(Root->GetModifyTime(), Before);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Modified", "Notify(ncFormModified)", "L.ItemsModified"}));

  // The active root also tells the host that the active module changed.
  Designer->RootActivated(Root);
  Log.Clear();
  QueryAs<IDesigner>(Root)->Modified();
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Modified", "Notify(ncFormModified)", "ActiveRootModified",
                                            "L.ItemsModified"}));

  // Closed: out of the list, the form gone, the listeners told; nothing else holds it.
  Log.Clear();
  Root->Close();
  EXPECT_EQ(Designer->GetRootsCount(), 0);
  EXPECT_EQ(Root->GetRoot(), nullptr);
  EXPECT_EQ(Root->GetRootName(), "Form1"); // kept across the close
  EXPECT_EQ(Log.Count("L.DesignerClosed"), 1);
  EXPECT_EQ(Kiln->RefCount(), 2); // this test's two references: the designer let go
  UnregisterDesignNotification(InterfaceOf<IDesignNotification>(Watcher.Get()));
}

TEST_F(KilnDesignFixture, AFailedConstructionLeavesTheDesignersListAsItWas) {
  NewForm("Form1");
  RegisterCustomModule(TBrokenForm::StaticClass(), TKilnCustomModule::StaticClass());
  IPtr<TRecordingModule> Module = New<TRecordingModule>("Broken.kfm", &Log);
  try {
    Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Broken.kfm", false, "Broken1", "BrokenForm", "",
                         nullptr, "");
    FAIL();
  } catch (const EComponentError& E) {
    EXPECT_EQ(E.Message(), "the form cannot be built");
  }
  EXPECT_EQ(Designer->GetRootsCount(), 1);

  // Without a registration for the base class, no root class: the framework's message.
  NotifyGroupChangeSubscribers(-1); // the package's registrations go
  try {
    NewForm("Form2");
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Root class not found: \"TForm\"");
  }
  EXPECT_EQ(Designer->GetRootsCount(), 1);
}

TEST_F(KilnDesignFixture, FramesAndDataModulesAreShownInAWindowOfTheirOwn) {
  IPtr<TRecordingModule> Module = New<TRecordingModule>("Frame1.kfm", &Log);
  IPtr<IRoot> Frame = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Frame1.kfm", false, "Frame1",
                                           "Frame", "", nullptr, "");
  Open.push_back(Frame);
  TKilnRoot* Kiln = KilnRoot(Frame);
  EXPECT_EQ(Frame->GetRoot()->ClassName(), "TFrame1");
  EXPECT_EQ(Frame->GetRoot()->ClassType()->Parent, TFrame::StaticClass());
  ASSERT_NE(Kiln->DesignWindow(), nullptr);
  EXPECT_NE(static_cast<TComponent*>(Kiln->DesignWindow()), Frame->GetRoot());
  EXPECT_EQ(static_cast<TControl*>(Frame->GetRoot())->Parent(), Kiln->DesignWindow());
  Frame->Show();
  EXPECT_TRUE(Kiln->DesignWindow()->Visible());
  Frame->Close(); // the window goes, the frame with the module
  EXPECT_EQ(Kiln->DesignWindow(), nullptr);
}

TEST_F(KilnDesignFixture, TheModuleRefusesChangesTheHostForbids) {
  IPtr<TRecordingModule> Module;
  IPtr<IRoot> Root = NewForm("Form1", &Module);
  TKilnRoot* Kiln = KilnRoot(Root);
  Module->ReadOnly = true;
  try {
    Kiln->ValidateModification();
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Source is read-only");
  }
  // Creation asks the host first: nothing is made.
  Arm(TButton::StaticClass());
  EXPECT_THROW(Kiln->CreateCurrentComponent(nullptr, Rect(8, 8, 9, 9)), EComponentDesignerException);
  EXPECT_EQ(Root->GetRoot()->ComponentCount(), 0);
  EXPECT_EQ(Log.Count("ToolUsed"), 1); // a failed creation disarms the tool too
  Module->ReadOnly = false;

  // Deleting is refused while the source is read-only.
  TComponent* Button = Kiln->CreateComponent(TButton::StaticClass(), Root->GetRoot(), 8, 8, 75, 25);
  Kiln->SelectComponent(Button);
  Module->ReadOnly = true;
  try {
    QueryAs<IDesigner>(Root)->DeleteSelection(false);
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Selection cannot be deleted.  Source is either in read only mode or is a resource form");
  }
  EXPECT_EQ(Root->GetRoot()->FindComponent("Button1"), Button);
  Module->ReadOnly = false;
}
