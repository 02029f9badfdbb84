//===- tests/core/DesignersTest.cpp - Designers, listeners, start and stop -===//
#include "core/CustomModules.h"
#include "core/DesignCore.h"
#include "core/DesignNotifications.h"
#include "core/Designers.h"
#include "core/EditorGroups.h"
#include "core/TopLevels.h"
#include "tests/fakes/FakeDesigner.h"
#include "tests/fakes/RecordingEnvironment.h"
#include "tests/fakes/RecordingModule.h"
#include "tests/fakes/RecordingServices.h"

#include <gtest/gtest.h>

#include <map>

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A listener that records what it hears and can run something during a call.
class TListener : public TInterfacedObject, public IDesignNotificationEx, public IDesignNotificationViews {
  FK_CLASS(TListener, TInterfacedObject)
  FK_INTERFACES(IDesignNotificationEx, IDesignNotificationViews)
  TListener(String Name, TCallLog* Log) : Name(std::move(Name)), Log(Log) {}
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override { Log->Add(Name + ".ItemDeleted"); }
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override { Log->Add(Name + ".ItemInserted"); }
  void ItemsModified(const IPtr<IDesigner>&) override {
    Log->Add(Name + ".ItemsModified");
    if (During) During();
  }
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>& S) override {
    Log->Add(Name + ".SelectionChanged(" + std::to_string(S ? S->GetCount() : -1) + ")");
  }
  void DesignerOpened(const IPtr<IDesigner>&, bool) override { Log->Add(Name + ".DesignerOpened"); }
  void DesignerClosed(const IPtr<IDesigner>&, bool) override {
    Log->Add(Name + ".DesignerClosed");
    if (During) During();
  }
  void DescendantUpdated(const IPtr<IDesigner>&) override { Log->Add(Name + ".DescendantUpdated"); }
  void ViewAdded(const IPtr<IDesigner>&, const String& V) override { Log->Add(Name + ".ViewAdded(" + V + ")"); }
  void ViewRemoved(const IPtr<IDesigner>&, const String& V) override { Log->Add(Name + ".ViewRemoved(" + V + ")"); }
  String Name;
  TCallLog* Log;
  std::function<void()> During;
};
FK_IMPLEMENT(TListener, "Tests") {}

/// A listener that knows only the base notification.
class TPlainListener : public TInterfacedObject, public IDesignNotification {
  FK_CLASS(TPlainListener, TInterfacedObject)
  FK_INTERFACES(IDesignNotification)
  explicit TPlainListener(TCallLog* Log) : Log(Log) {}
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemsModified(const IPtr<IDesigner>&) override { Log->Add("Plain.ItemsModified"); }
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}
  void DesignerOpened(const IPtr<IDesigner>&, bool) override {}
  void DesignerClosed(const IPtr<IDesigner>&, bool) override {}
  TCallLog* Log;
};
FK_IMPLEMENT(TPlainListener, "Tests") {}

/// A root class of a framework the fake designers serve, and one they do not.
struct TFakeForm : TComponent {
  FK_CLASS(TFakeForm, TComponent)
};
FK_IMPLEMENT(TFakeForm, "FakeForms") {}
struct TFakeFrame : TFakeForm {
  FK_CLASS(TFakeFrame, TFakeForm)
};
FK_IMPLEMENT(TFakeFrame, "FakeForms") {}
struct TOtherForm : TComponent {
  FK_CLASS(TOtherForm, TComponent)
};
FK_IMPLEMENT(TOtherForm, "OtherForms") {}

class TTestModule : public TBaseCustomModule, public ICustomModule {
  FK_CLASS(TTestModule, TBaseCustomModule)
  FK_INTERFACES(ICustomModule)
  TCustomModuleAttributes GetAttributes() override { return {}; }
  void ExecuteVerb(int) override {}
  String GetVerb(int) override { return ""; }
  int GetVerbCount() override { return 0; }
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  void Saving() override {}
  void ValidateComponent(TComponent*) override {}
  bool ValidateComponentClass(TClass) override { return true; }
  bool Nestable() override { return true; }
};
FK_IMPLEMENT(TTestModule, "Tests") {}
struct TOtherModule : TTestModule {
  FK_CLASS(TOtherModule, TTestModule)
  bool Nestable() override { return false; }
};
FK_IMPLEMENT(TOtherModule, "Tests") {}

/// Records the root-activated and deactivated events.
struct TEventSink : TObject {
  explicit TEventSink(TCallLog* Log) : Log(Log) {}
  void RootActivated(TObject* Sender, const IPtr<ICustomModule>& Module) {
    Log->Add(String("RootActivated(") + (Sender ? "designers" : "nil") + "," +
             (Module ? (Module == StubCustomModule() ? "stub" : "module") : "nil") + ")");
  }
  void Deactivated(TObject*) { Log->Add("DesignerDeactivated"); }
  void Modified(TObject*) { Log->Add("ActiveRootModifiedEvent"); }
  TCallLog* Log;
};

struct DesignCoreFixture : ::testing::Test {
  TCallLog Log;
  IPtr<TRecordingServices> Services;
  TEventSink Sink{&Log};

  void SetUp() override {
    StartDesignCore();
    Services = New<TRecordingServices>();
    Services->Palette = New<TRecordingPalette>(&Log);
    HalvernIDEServices = QueryAs<IHalvernIDEServices>(InterfaceOf<IHalvernIDEServices>(Services.Get()));
    EvRootActivatedEvent->Add(TRootActivatedEvent::Bind<&TEventSink::RootActivated>(&Sink));
    EvDesignerDeactivated->Add(TNotifyEvent::Bind<&TEventSink::Deactivated>(&Sink));
    EvActiveRootModifiedEvent->Add(TNotifyEvent::Bind<&TEventSink::Modified>(&Sink));
  }
  void TearDown() override {
    HalvernIDEServices = nullptr;
    StopDesignCore();
  }
  IPtr<TFakeDesigner> MakeDesigner(const char* Ext, IPtr<TRecordingEnvironment> Env = nullptr) {
    return New<TFakeDesigner>(IPtr<IDesignEnvironment>(InterfaceOf<IDesignEnvironment>(Env.Get())), Ext,
                              TFakeForm::StaticClass());
  }
  static IPtr<IComponentDesigner> AsDesigner(const IPtr<TFakeDesigner>& D) {
    return InterfaceOf<IComponentDesigner>(D.Get());
  }
  static IPtr<IRoot> AsRoot(const IPtr<TFakeRoot>& R) { return InterfaceOf<IRoot>(R.Get()); }
  static IPtr<IDesigner> AsIDesigner(const IPtr<TFakeRoot>& R) { return InterfaceOf<IDesigner>(R.Get()); }
};

} // namespace

//===----------------------------------------------------------------------===//
// Listeners and broadcasts
//===----------------------------------------------------------------------===//

TEST_F(DesignCoreFixture, BroadcastsGoFromTheLastListenerToTheFirst) {
  auto A = New<TListener>("A", &Log), B = New<TListener>("B", &Log), C = New<TListener>("C", &Log);
  for (auto& L : {A, B, C}) RegisterDesignNotification(InterfaceOf<IDesignNotification>(L.Get()));
  DesignNotificationItemsModified(nullptr);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"C.ItemsModified", "B.ItemsModified", "A.ItemsModified"}));

  // A listener that leaves during the call, and one that removes a later one.
  Log.Clear();
  B->During = [&] { UnregisterDesignNotification(InterfaceOf<IDesignNotification>(B.Get())); };
  C->During = [&] { UnregisterDesignNotification(InterfaceOf<IDesignNotification>(C.Get())); };
  DesignNotificationItemsModified(nullptr);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"C.ItemsModified", "B.ItemsModified", "A.ItemsModified"}));
  Log.Clear();
  DesignNotificationItemsModified(nullptr);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"A.ItemsModified"}));
}

TEST_F(DesignCoreFixture, ClosingBroadcastWalksACopyInOrderAndSkipsWhoLeft) {
  auto A = New<TListener>("A", &Log), B = New<TListener>("B", &Log), C = New<TListener>("C", &Log);
  for (auto& L : {A, B, C}) RegisterDesignNotification(InterfaceOf<IDesignNotification>(L.Get()));
  A->During = [&] { UnregisterDesignNotification(InterfaceOf<IDesignNotification>(B.Get())); };
  DesignNotificationDesignerClosed(nullptr, false);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"A.DesignerClosed", "C.DesignerClosed"}));
}

TEST_F(DesignCoreFixture, ARepeatedRegistrationIsCalledTwiceAndUnregisteredOnce) {
  auto A = New<TListener>("A", &Log);
  auto Plain = New<TPlainListener>(&Log);
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(A.Get()));
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(A.Get()));
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(Plain.Get()));
  DesignNotificationItemsModified(nullptr);
  EXPECT_EQ(Log.Count("A.ItemsModified"), 2);
  // Side interfaces are reached only where a listener answers to them.
  Log.Clear();
  DesignNotificationDescendantUpdated(nullptr);
  DesignNotificationViewAdded(nullptr, "Phone");
  DesignNotificationViewRemoved(nullptr, "Phone");
  EXPECT_EQ(Log.Calls, (std::vector<String>{"A.DescendantUpdated", "A.DescendantUpdated", "A.ViewAdded(Phone)",
                                            "A.ViewAdded(Phone)", "A.ViewRemoved(Phone)", "A.ViewRemoved(Phone)"}));
  UnregisterDesignNotification(InterfaceOf<IDesignNotification>(A.Get()));
  Log.Clear();
  DesignNotificationItemsModified(nullptr);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Plain.ItemsModified"}));
}

TEST_F(DesignCoreFixture, NoIconClassesComeThroughTheFrameworkHook) {
  TComponent* Frame = CreateComponentOf<TFakeFrame>(nullptr);
  TComponent* Other = CreateComponentOf<TOtherForm>(nullptr);
  EXPECT_TRUE(IsNoIconComponent(nullptr));
  EXPECT_FALSE(IsNoIconComponent(Frame));
  RegisterNoIcon({TFakeForm::StaticClass()});
  EXPECT_TRUE(IsNoIconComponent(Frame)); // an instance of a descendant counts
  EXPECT_FALSE(IsNoIconComponent(Other));
  Frame->Destroy();
  Other->Destroy();
}

//===----------------------------------------------------------------------===//
// Designers
//===----------------------------------------------------------------------===//

TEST_F(DesignCoreFixture, WithoutDesignersTheCollectionAnswersEmpty) {
  IPtr<IInternalComponentDesigners> D = Designers();
  EXPECT_FALSE(D->GetControlsLocked());
  EXPECT_EQ(D->GetFirstSelectionType(), "");
  EXPECT_EQ(D->GetAlignable(), nullptr);
  EXPECT_FALSE(D->DesignerActive());
  EXPECT_EQ(ActiveDesigner(), nullptr);
  EXPECT_EQ(ActiveRoot(), nullptr);
  String Keyword = "x", File = "y";
  int Type = 0;
  EXPECT_FALSE(D->SpecialPropertyHelp("Caption", Keyword, File, Type));
  EXPECT_EQ(Keyword, "");
  EXPECT_EQ(D->DesignerFromExtension(".kfm"), nullptr);
}

TEST_F(DesignCoreFixture, RegistrationActivatesTheFirstDesignerAndFindsByExtension) {
  auto Env = New<TRecordingEnvironment>(&Log);
  auto Kiln = MakeDesigner(".kfm", Env);
  auto Skein = MakeDesigner(".sfm", Env);
  Designers()->RegisterDesigner(AsDesigner(Kiln));
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Palette.BeginUpdate", "Palette.Remove(NativeDesignerActive)",
                                            "Palette.Remove(CodeEditorActive)", "RootActivated(designers,nil)",
                                            "Palette.EndUpdate", "SelectionChanged"}));
  Log.Clear();
  Designers()->RegisterDesigner(AsDesigner(Skein));
  EXPECT_TRUE(Log.Calls.empty()); // the first stays active
  EXPECT_EQ(ActiveDesigner(), AsDesigner(Kiln));
  EXPECT_EQ(Designers()->RegisteredExtensions(), (std::vector<String>{".kfm", ".sfm"}));
  EXPECT_EQ(Designers()->DesignerFromExtension(".SFM"), AsDesigner(Skein));

  // The same designer with the same root: only the palette's context name.
  Designers()->ActivateDesigner(AsDesigner(Kiln));
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Palette.Add(NativeDesignerActive)"}));

  Log.Clear();
  Designers()->UnregisterDesigner(AsDesigner(Kiln));
  EXPECT_EQ(ActiveDesigner(), nullptr);
  EXPECT_EQ(Designers()->RegisteredExtensions(), (std::vector<String>{".sfm"}));
  EXPECT_EQ(Designers()->DesignerFromExtension(".kfm"), nullptr);
  Designers()->UnregisterDesigner(AsDesigner(Skein));
}

TEST_F(DesignCoreFixture, ActivatingARootMovesItFrontSelectsAndTellsEveryone) {
  auto Env = New<TRecordingEnvironment>(&Log);
  auto Designer = MakeDesigner(".kfm", Env);
  Designers()->RegisterDesigner(AsDesigner(Designer));
  auto Listener = New<TListener>("L", &Log);
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(Listener.Get()));
  auto Form1 = Designer->AddRoot("Form1", &Log);
  auto Form2 = Designer->AddRoot("Form2", &Log);
  Form2->CustomModule = NewAs<ICustomModule, TTestModule>();
  TComponent* Button = CreateComponentOf<TComponent>(Form2->RootComponent());
  Form2->Selected = {Button};
  Form1->Dormant = true; // skipped when selections are gathered

  Log.Clear();
  Designer->RootActivated(AsRoot(Form2));
  EXPECT_EQ(Designer->GetRoots(0), AsRoot(Form2));
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Form2.SetActive(True)", "L.SelectionChanged(1)", "SelectionChanged",
                                            "ActiveRootChanged", "Palette.BeginUpdate",
                                            "Palette.Add(NativeDesignerActive)", "Palette.Remove(CodeEditorActive)",
                                            "RootActivated(designers,module)", "Palette.EndUpdate"}));
  EXPECT_EQ(ActiveRoot(), AsRoot(Form2));
  EXPECT_EQ(Designers()->GetFirstSelectionType(), "TComponent");
  EXPECT_EQ(Designers()->GetFirstSelectionUnit(), "Classes");
  EXPECT_EQ(Designers()->GetAlignable(), InterfaceOf<IOTAAlignable>(Form2.Get()));

  // The same selection again is no change for the environment.
  Log.Clear();
  IPtr<IDesignerSelections> Same = CreateSelectionList();
  Same->Add(Button);
  Designer->SetSelection(AsIDesigner(Form2), nullptr, Same);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"L.SelectionChanged(1)"}));

  // Another root takes over: the old one hears first.
  Log.Clear();
  Designer->SetSelection(AsIDesigner(Form1), nullptr, CreateSelectionList());
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Form2.SetActive(False)", "Form1.SetActive(True)",
                                            "L.SelectionChanged(0)", "SelectionChanged"}));
  EXPECT_EQ(Designer->Selections(), nullptr); // an empty selection counts as none
  EXPECT_EQ(Designers()->GetFirstSelectionType(), "");

  // A modified active root sends the event and tells the host; any root tells listeners.
  Log.Clear();
  Designer->RootModified(AsRoot(Form1));
  Designer->RootModified(AsRoot(Form2));
  EXPECT_EQ(Log.Calls, (std::vector<String>{"ActiveRootModifiedEvent", "ActiveRootModified", "L.ItemsModified",
                                            "L.ItemsModified"}));

  // Identifying a custom module by its root: the root's qualified class, then the
  // module's identifier when the host gives one.
  auto Module = New<TRecordingModule>("Form2.kfm");
  Form2->Module = InterfaceOf<IDesignerModule>(Module.Get());
  EXPECT_EQ(Designers()->GetCustomModuleIdentifier(Form2->CustomModule), "Classes.TComponent");
  Module->ModuleIdentifier = "Main";
  EXPECT_EQ(Designers()->GetCustomModuleIdentifier(Form2->CustomModule), "Classes.TComponent.Main");
  EXPECT_EQ(Designers()->GetCustomModuleIdentifier(NewAs<ICustomModule, TTestModule>()), "");

  // Leaving the list while active tells the collection.
  Designer->RootActivated(AsRoot(Form2));
  Designer->RootListRemove(AsRoot(Form2));
  EXPECT_EQ(Designer->GetActiveRoot(), nullptr);
  EXPECT_EQ(Designer->GetRootsCount(), 1);
  EXPECT_THROW(Designer->GetRoots(1), EListError);
  Designer->RootListRemove(AsRoot(Form1));
  Designers()->UnregisterDesigner(AsDesigner(Designer));
}

TEST_F(DesignCoreFixture, DeactivationAndSurfacesOutsideTheLibrary) {
  auto Designer = MakeDesigner(".kfm");
  Designers()->RegisterDesigner(AsDesigner(Designer));
  Log.Clear();
  Designers()->DesignerDeactivated();
  EXPECT_EQ(Log.Calls, (std::vector<String>{"DesignerDeactivated", "Palette.Remove(NativeDesignerActive)"}));
  Log.Clear();
  Designers()->DesignerDeactivated(); // none active: no event, the palette is still told
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Palette.Remove(NativeDesignerActive)"}));
  Log.Clear();
  dynamic_cast<TDesigners*>(Designers().Get())->ActivateNonKilnDesigner();
  EXPECT_EQ(Log.Calls, (std::vector<String>{"RootActivated(nil,stub)"}));
  Designers()->UnregisterDesigner(AsDesigner(Designer));
}

//===----------------------------------------------------------------------===//
// Custom modules
//===----------------------------------------------------------------------===//

TEST_F(DesignCoreFixture, LaterRegistrationsHideEarlierOnesUntilTheirGroupGoes) {
  auto Designer = MakeDesigner(".kfm");
  CurrentGroup = 1;
  RegisterCustomModule(TFakeForm::StaticClass(), TTestModule::StaticClass());
  CurrentGroup = 2;
  RegisterCustomModule(TFakeForm::StaticClass(), TOtherModule::StaticClass());
  RegisterCustomModule(TOtherForm::StaticClass(), TTestModule::StaticClass());
  CurrentGroup = -1;
  EXPECT_EQ(GetClass("TFakeForm"), TFakeForm::StaticClass()); // registered for reading streams

  EXPECT_EQ(Designer->FindCustomModuleClass("tfakeform"), TOtherModule::StaticClass());
  EXPECT_FALSE(Designer->IsNestable("TFakeForm"));
  EXPECT_EQ(Designer->FindBaseClass("TFakeForm"), "TFakeForm");
  // Another framework's root class is not this designer's.
  EXPECT_EQ(Designer->FindCustomModuleClass("TOtherForm"), nullptr);
  EXPECT_EQ(Designer->FindBaseClass("TOtherForm"), "TForm");
  EXPECT_EQ(Designer->FindBaseClass(""), "TForm");
  EXPECT_FALSE(Designer->IsRootBaseClass(""));
  EXPECT_TRUE(Designers()->RootComponentClass(TOtherForm::StaticClass()));
  EXPECT_FALSE(Designers()->RootComponentClass(TFakeFrame::StaticClass())); // exactly the base class

  NotifyGroupChangeSubscribers(7); // a group without registrations changes nothing
  EXPECT_EQ(CustomModuleRegs().size(), 3u);
  NotifyGroupChangeSubscribers(2);
  EXPECT_EQ(CustomModuleRegs().size(), 1u);
  EXPECT_EQ(Designer->FindCustomModuleClass("TFakeForm"), TTestModule::StaticClass());
  EXPECT_TRUE(Designer->IsNestable("TFakeForm"));
  EXPECT_TRUE(Designer->IsRootBaseClass("TFakeForm"));
  EXPECT_FALSE(Designer->IsNestable("TNoSuchForm"));
}

TEST_F(DesignCoreFixture, TheStubCustomModuleDoesNothing) {
  IPtr<ICustomModule> Stub = StubCustomModule();
  EXPECT_EQ(Stub, StubCustomModule()); // one instance
  EXPECT_TRUE(Stub->GetAttributes().Empty());
  EXPECT_EQ(Stub->GetVerb(0), "");
  EXPECT_EQ(Stub->GetVerbCount(), 0);
  EXPECT_FALSE(Stub->ValidateComponentClass(TComponent::StaticClass()));
  EXPECT_FALSE(Stub->Nestable());
}

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

namespace {
std::vector<String> InitOrder;
void InitFirst(const IPtr<IDesignEnvironment>&) { InitOrder.push_back("first"); }
void InitSecond(const IPtr<IDesignEnvironment>&) { InitOrder.push_back("second"); }
} // namespace

TEST(DesignCore, StartsInStageOrderAndStopsInReverse) {
  std::vector<String> Seen;
  AddDesignCoreStep(TCoreStage::DefaultRegistrations, "TestDefaults", [&] { Seen.push_back("defaults+"); },
                    [&] { Seen.push_back("defaults-"); });
  AddDesignCoreStep(TCoreStage::Registries, "TestRegistry",
                    [&] { Seen.push_back(Designers() ? "registry+ after core" : "registry+"); },
                    [&] { Seen.push_back(Designers() ? "registry- core still up" : "registry- after core"); });
  std::vector<String> Names = DesignCoreStepNames();
  EXPECT_EQ(Names.front(), "TestRegistry");
  EXPECT_EQ(Names.back(), "TestDefaults");
  EXPECT_EQ(Names[1], "DesignNotifications");

  EXPECT_FALSE(DesignCoreRunning());
  EXPECT_EQ(EvRootActivatedEvent, nullptr);
  StartDesignCore();
  StartDesignCore(); // a second start does nothing
  EXPECT_TRUE(DesignCoreRunning());
  EXPECT_NE(EvRootActivatedEvent, nullptr);
  EXPECT_NE(EvDesignerDeactivated, nullptr);
  EXPECT_TRUE(RegisterCustomModuleProc);
  EXPECT_TRUE(RegisterDesignNotificationProc);
  EXPECT_TRUE(GetTopLevelComponentFunc);
  EXPECT_TRUE(RegisterNoIconProc);
  StopDesignCore();
  EXPECT_EQ(Seen, (std::vector<String>{"registry+", "defaults+", "defaults-", "registry- after core"}));
  EXPECT_EQ(EvRootActivatedEvent, nullptr);
  EXPECT_EQ(Designers(), nullptr);
  EXPECT_FALSE(RegisterCustomModuleProc);
  EXPECT_FALSE(RegisterDesignNotificationProc);
  EXPECT_FALSE(GetTopLevelComponentFunc);
  // Registrations while the core is stopped are lost without an error.
  EXPECT_NO_THROW(RegisterDesignNotification(nullptr));

  // A step added while the core runs starts at once; removing it stops it.
  StartDesignCore();
  Seen.clear();
  AddDesignCoreStep(TCoreStage::DefaultRegistrations, "Late", [&] { Seen.push_back("late+"); },
                    [&] { Seen.push_back("late-"); });
  RemoveDesignCoreStep("Late");
  RemoveDesignCoreStep("TestRegistry");
  RemoveDesignCoreStep("TestDefaults");
  StopDesignCore();
  EXPECT_EQ(Seen, (std::vector<String>{"late+", "late-", "registry- core still up", "defaults-"}));
  EXPECT_EQ(DesignCoreStepNames().front(), "DesignNotifications");
}

TEST(DesignCore, InitializeDesignersRunsEachProcedureOnceThenTheStringsFileSystem) {
  InitOrder.clear();
  std::vector<String> FileSystem;
  RegisterStringsFileSystemProc = [&](bool Register) { FileSystem.push_back(Register ? "register" : "unregister"); };
  StartDesignCore();
  InitializeDesigners(nullptr); // before any registration: still the file system
  EXPECT_EQ(FileSystem, std::vector<String>{"register"});
  RegisterInitializeDesigner(&InitFirst);
  RegisterInitializeDesigner(&InitSecond);
  RegisterInitializeDesigner(&InitFirst);
  InitializeDesigners(nullptr);
  EXPECT_EQ(InitOrder, (std::vector<String>{"first", "second"}));
  StopDesignCore();
  EXPECT_EQ(FileSystem, (std::vector<String>{"register", "register", "unregister"}));
  RegisterStringsFileSystemProc = nullptr;
}

//===----------------------------------------------------------------------===//
// Top-level windows
//===----------------------------------------------------------------------===//

namespace {
class TWindowHandler : public TInterfacedObject, public ITopLevelsHandler {
  FK_CLASS(TWindowHandler, TInterfacedObject)
  FK_INTERFACES(ITopLevelsHandler)
  std::map<HWND, TComponent*> Windows;
  TComponent* ComponentFromWindow(HWND Wnd) override {
    auto It = Windows.find(Wnd);
    return It == Windows.end() ? nullptr : It->second;
  }
  bool ActivateTopLevelComponent(TComponent* C) override {
    for (auto& [W, Comp] : Windows)
      if (Comp == C) return true;
    return false;
  }
  bool CaptionFromComponent(TComponent* C, String& Caption) override {
    if (!ActivateTopLevelComponent(C)) return false;
    Caption = "Window of " + C->Name();
    return true;
  }
  bool IsComponentDesigner(TComponent*) override { return false; }
};
FK_IMPLEMENT(TWindowHandler, "Tests") {}
} // namespace

TEST_F(DesignCoreFixture, TopLevelComponentFollowsTheActiveWindowThenZOrder) {
  auto Handler = New<TWindowHandler>();
  TComponent* A = CreateComponentOf<TComponent>(nullptr);
  TComponent* B = CreateComponentOf<TComponent>(nullptr);
  TComponent* C = CreateComponentOf<TComponent>(nullptr);
  A->SetName("A");
  Handler->Windows = {{1, A}, {2, B}, {3, C}};
  RegisterHandler(InterfaceOf<ITopLevelsHandler>(Handler.Get()));
  TWindowList::SetWindows({{4, true, false}, {1, true, true}, {2, false, false}, {3, true, false}});
  TWindowList::SetActiveWindow(1);
  EXPECT_EQ(TopLevelComponent(nullptr), A);
  EXPECT_EQ(GetTopLevelComponentFunc(nullptr), A);
  // Excluding the active one: window 4 has no component, 1 is topmost, 2 is hidden.
  EXPECT_EQ(TopLevelComponent(A), C);
  TWindowList::SetActiveWindow(0);
  EXPECT_EQ(TopLevelComponent(C), nullptr);
  EXPECT_EQ(CaptionFromComponent(A), "Window of A");
  EXPECT_TRUE(ActivateTopLevelComponent(B));
  UnregisterHandler(InterfaceOf<ITopLevelsHandler>(Handler.Get()));
  EXPECT_EQ(ComponentFromWindow(1), nullptr);
  EXPECT_EQ(CaptionFromComponent(A), "");
  TWindowList::SetWindows({});
  for (TComponent* X : {A, B, C}) X->Destroy();
}

//===----------------------------------------------------------------------===//
// Finding, opening and ordering roots
//===----------------------------------------------------------------------===//

TEST_F(DesignCoreFixture, OpenRootClassFindsOrAsksTheHostAndResurrects) {
  auto Env = New<TRecordingEnvironment>(&Log);
  auto Designer = MakeDesigner(".kfm", Env);
  Designers()->RegisterDesigner(AsDesigner(Designer));
  auto Form1 = Designer->AddRoot("Form1", &Log);
  Form1->Dormant = true;
  Log.Clear();
  // The leading T goes; a dormant root comes back.
  EXPECT_EQ(Designer->OpenRootClass("TForm1"), AsRoot(Form1));
  EXPECT_FALSE(Form1->Dormant);
  EXPECT_EQ(Log.Calls, std::vector<String>{"Form1.Resurrect"});

  // Not open: the host is asked to open it, and the search runs again.
  IPtr<TFakeRoot> Opened;
  Env->OnOpenModuleByName = [&](const String& Name) { Opened = Designer->AddRoot(Name, &Log); };
  Log.Clear();
  IPtr<IRoot> Found = Designer->OpenRootClass("TUnit2");
  EXPECT_EQ(Log.Calls.front(), "OpenModuleByName(Unit2)");
  EXPECT_EQ(Found, AsRoot(Opened));
  Env->OnOpenModuleByName = nullptr;
  EXPECT_EQ(Designer->OpenRootClass("TNowhere"), nullptr);

  // Another designer's roots are found by name and by component, after this one's own.
  auto Other = MakeDesigner(".sfm", Env);
  Designers()->RegisterDesigner(AsDesigner(Other));
  auto Far = Other->AddRoot("FarForm", &Log);
  EXPECT_EQ(Designer->FindRoot(String("farform")), AsRoot(Far));
  EXPECT_EQ(Designer->FindRoot(Far->RootComponent()), AsRoot(Far));
  IPtr<IRoot> ByFile;
  EXPECT_TRUE(Designers()->FindFile("FarForm.kfm", ByFile));
  EXPECT_EQ(ByFile, AsRoot(Far));
  std::vector<String> Names;
  Designer->GetRootNames([&](const String& N) { Names.push_back(N); });
  EXPECT_EQ(Names, (std::vector<String>{"Form1", "Unit2"}));
  for (auto& R : {Form1, Opened}) Designer->RootListRemove(AsRoot(R));
  Other->RootListRemove(AsRoot(Far));
  Designers()->UnregisterDesigner(AsDesigner(Other));
  Designers()->UnregisterDesigner(AsDesigner(Designer));
}

TEST_F(DesignCoreFixture, RootsWithoutAncestorsComeFirstBeforeDependenciesAreDropped) {
  auto Designer = MakeDesigner(".kfm");
  auto A = Designer->AddRoot("A", &Log);
  auto B = Designer->AddRoot("B", &Log);
  auto C = Designer->AddRoot("C", &Log);
  auto D = Designer->AddRoot("D", &Log);
  A->Ancestor = AsRoot(D); // A and C inherit; B and D do not
  C->Ancestor = AsRoot(D);
  Log.Clear();
  Designer->RemoveDependenciesOn(nullptr);
  std::vector<String> Order;
  for (int I = 0; I < Designer->GetRootsCount(); ++I) Order.push_back(Designer->GetRoots(I)->GetRootName());
  EXPECT_EQ(Order, (std::vector<String>{"B", "D", "C", "A"}));
  EXPECT_EQ(Log.Calls, (std::vector<String>{"B.RemoveDependenciesOn", "D.RemoveDependenciesOn",
                                            "C.RemoveDependenciesOn", "A.RemoveDependenciesOn"}));
  A->Ancestor = C->Ancestor = nullptr;
  for (auto& R : {A, B, C, D}) Designer->RootListRemove(AsRoot(R));
}

namespace {
class TWindowListener : public TListener, public IDesignWindow {
  FK_CLASS(TWindowListener, TListener)
  FK_INTERFACES(IDesignWindow)
  using TListener::TListener;
  void ItemDeleted(const IPtr<IDesigner>& D, TPersistent* I) override { TListener::ItemDeleted(D, I); }
  void ItemInserted(const IPtr<IDesigner>& D, TPersistent* I) override { TListener::ItemInserted(D, I); }
  void ItemsModified(const IPtr<IDesigner>& D) override { TListener::ItemsModified(D); }
  void SelectionChanged(const IPtr<IDesigner>& D, const IPtr<IDesignerSelections>& S) override {
    TListener::SelectionChanged(D, S);
  }
  void DesignerOpened(const IPtr<IDesigner>& D, bool R) override { TListener::DesignerOpened(D, R); }
  void DesignerClosed(const IPtr<IDesigner>& D, bool G) override { TListener::DesignerClosed(D, G); }
  void WindowHide() override { Log->Add(Name + ".WindowHide"); }
  void WindowShow() override { Log->Add(Name + ".WindowShow"); }
};
} // namespace
FK_IMPLEMENT(TWindowListener, "Tests") {}

TEST_F(DesignCoreFixture, HidingWindowsTellsDesignWindowsLastFirstThenEachRootInOrder) {
  auto Designer = MakeDesigner(".kfm");
  Designers()->RegisterDesigner(AsDesigner(Designer));
  auto W1 = New<TWindowListener>("W1", &Log), W2 = New<TWindowListener>("W2", &Log);
  auto Plain = New<TPlainListener>(&Log);
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(W1.Get()));
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(Plain.Get()));
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(W2.Get()));
  auto A = Designer->AddRoot("A", &Log), B = Designer->AddRoot("B", &Log);
  Log.Clear();
  Designers()->HideWindows();
  EXPECT_EQ(Log.Calls, (std::vector<String>{"W2.WindowHide", "W1.WindowHide", "A.HideForModule", "B.HideForModule"}));
  Log.Clear();
  Designers()->ShowWindows();
  EXPECT_EQ(Log.Calls, (std::vector<String>{"W2.WindowShow", "W1.WindowShow", "A.ShowForModule", "B.ShowForModule"}));
  Designers()->SetControlsLocked(true);
  EXPECT_TRUE(A->Locked && B->Locked);
  EXPECT_TRUE(Designers()->GetControlsLocked());
  for (auto& R : {A, B}) Designer->RootListRemove(AsRoot(R));
  Designers()->UnregisterDesigner(AsDesigner(Designer));
}

namespace {
struct TThrowingSink : TObject {
  void RootActivated(TObject*, const IPtr<ICustomModule>&) { throw EComponentDesignerException("handler failed"); }
};
} // namespace

TEST_F(DesignCoreFixture, AFailingHandlerStillClosesThePalettesBatch) {
  TThrowingSink Throwing;
  EvRootActivatedEvent->Add(TRootActivatedEvent::Bind<&TThrowingSink::RootActivated>(&Throwing));
  Log.Clear();
  EXPECT_THROW(EvRootActivatedEvent->Send(nullptr, StubCustomModule()), EComponentDesignerException);
  EXPECT_EQ(Log.Calls, (std::vector<String>{"Palette.BeginUpdate", "Palette.Add(NativeDesignerActive)",
                                            "Palette.Remove(CodeEditorActive)", "Palette.EndUpdate"}));
  EvRootActivatedEvent->Remove(TRootActivatedEvent::Bind<&TThrowingSink::RootActivated>(&Throwing));
  // Without the host's service object the handlers are still called.
  HalvernIDEServices = nullptr;
  Log.Clear();
  EvRootActivatedEvent->Send(nullptr, nullptr);
  EXPECT_EQ(Log.Calls, std::vector<String>{"RootActivated(nil,nil)"});
}

TEST_F(DesignCoreFixture, TopLevelHandlersAreAskedInOrderUntilOneAnswers) {
  auto First = New<TWindowHandler>(), Second = New<TWindowHandler>();
  TComponent* A = CreateComponentOf<TComponent>(nullptr);
  TComponent* B = CreateComponentOf<TComponent>(nullptr);
  A->SetName("A");
  B->SetName("B");
  First->Windows = {{1, A}};
  Second->Windows = {{1, B}, {2, B}};
  RegisterHandler(InterfaceOf<ITopLevelsHandler>(First.Get()));
  RegisterHandler(InterfaceOf<ITopLevelsHandler>(Second.Get()));
  EXPECT_EQ(ComponentFromWindow(1), A); // the first that knows the window
  EXPECT_EQ(ComponentFromWindow(2), B);
  EXPECT_EQ(ComponentFromWindow(0), nullptr);
  EXPECT_EQ(CaptionFromComponent(B), "Window of B");
  EXPECT_FALSE(IsComponentDesigner(A));
  EXPECT_TRUE(TopLevelComponents().empty());
  UnregisterHandler(InterfaceOf<ITopLevelsHandler>(First.Get()));
  EXPECT_EQ(ComponentFromWindow(1), B);
  UnregisterHandler(InterfaceOf<ITopLevelsHandler>(Second.Get()));
  A->Destroy();
  B->Destroy();
}
