//===- tests/editors/ActionEditorsTest.cpp - Registries of actions and frameworks ===//
#include "editors/ActionEditors.h"
#include "frameworks/kiln/KilnActions.h"

#include "core/EditorGroups.h"
#include "platform/ScopeGuard.h"

#include <gtest/gtest.h>

namespace formkit {
namespace {

//===----------------------------------------------------------------------===//
// Sample frameworks, actions and resources
//===----------------------------------------------------------------------===//

/// A framework whose actions are Kiln's.
class TSampleIDEActions : public TIDEActions {
  FK_CLASS(TSampleIDEActions, TIDEActions)
  TClass DefaultActionClass() override { return TAction::StaticClass(); }
  TClass BaseActionClass() override { return TAction::StaticClass(); }
  TClass BaseActionListClass() override { return TActionList::StaticClass(); }
};
FK_IMPLEMENT(TSampleIDEActions, "ActionSamples") {}

/// A framework that tells nothing.
class TSilentIDEActions : public TIDEActions {
  FK_CLASS(TSilentIDEActions, TIDEActions)
};
FK_IMPLEMENT(TSilentIDEActions, "ActionSamples") {}

class TFileOpen : public TAction {
  FK_CLASS(TFileOpen, TAction)
};
FK_IMPLEMENT(TFileOpen, "ActionSamples") {}
class TFileSave : public TAction {
  FK_CLASS(TFileSave, TAction)
};
FK_IMPLEMENT(TFileSave, "ActionSamples") {}
class TSearchFind : public TAction {
  FK_CLASS(TSearchFind, TAction)
};
FK_IMPLEMENT(TSearchFind, "ActionSamples") {}
class TKilnToolAction : public TAction {
  FK_CLASS(TKilnToolAction, TAction)
};
FK_IMPLEMENT(TKilnToolAction, "ActionSamples") {}
class TAb : public TAction {
  FK_CLASS(TAb, TAction)
};
FK_IMPLEMENT(TAb, "ActionSamples") {}
/// A contained action of no framework's base class.
class TLooseAction : public TContainedAction {
  FK_CLASS(TLooseAction, TContainedAction)
};
FK_IMPLEMENT(TLooseAction, "ActionSamples") {}

/// Prototypes of the file actions; counts the instances made.
class TFileResource : public TComponent {
  FK_CLASS(TFileResource, TComponent)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    ++Made;
    auto* Open = CreateComponentOf<TFileOpen>(this);
    Open->SetCategory("Files");
    Open->SetCaption("&Open...");
    Open->SetHint("Open|Opens a file");
    Open->SetShortCut(0x4000 | 'O');
    Open->SetImageIndex(7);
    Open->SetChecked(true);
  }
  static inline int Made = 0;
};
FK_IMPLEMENT(TFileResource, "ActionSamples") {}

/// A resource whose "prototype" of TFileSave is no action.
class TBrokenResource : public TComponent {
  FK_CLASS(TBrokenResource, TComponent)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    CreateComponent(FakeClass(), this);
  }
  /// A plain component class that carries the name "TFileSave".
  static TClass FakeClass();
};
FK_IMPLEMENT(TBrokenResource, "ActionSamples") {}

TClass TBrokenResource::FakeClass() {
  static TGeneratedClass Fake = TClassRec::NewGeneratedClass(TComponent::StaticClass(), "TFileSave", "ActionSamples");
  return Fake.get();
}

//===----------------------------------------------------------------------===//
// The fixture
//===----------------------------------------------------------------------===//

int Notifications = 0;
void CountNotification() { ++Notifications; }

struct ActionEditorsTest : ::testing::Test {
  TObjectGuard<TComponent> Owner{CreateComponentOf<TComponent>(nullptr)};

  void SetUp() override {
    StartActionEditors();
    Notifications = 0;
    NotifyActionListChange = &CountNotification;
  }
  void TearDown() override {
    NotifyActionListChange = nullptr;
    StopActionEditors();
  }
  template <class F> static void ExpectActionError(F&& Run, const String& Message) {
    try {
      Run();
      ADD_FAILURE() << "no error; expected: " << Message;
    } catch (const EActionError& E) {
      EXPECT_EQ(E.Message(), Message);
    }
  }
  /// "Category:Class" for each enumerated class.
  static std::vector<String> Enumerated(const String& FrameworkType) {
    std::vector<String> Seen;
    EnumActions([&](const String& Category, TClass C, void*) { Seen.push_back(Category + ":" + C->ClassName); },
                nullptr, FrameworkType);
    return Seen;
  }
  static std::vector<String> ClassesOf(const TActionCategoryRec& Rec) {
    std::vector<String> Names;
    for (const TActionClassRec& E : Rec.Actions) Names.push_back(E.ActionClass ? E.ActionClass->ClassName : "nil");
    return Names;
  }
};

//===----------------------------------------------------------------------===//
// Frameworks
//===----------------------------------------------------------------------===//

TEST_F(ActionEditorsTest, FrameworksRegisterOnceByTrimmedUpperCaseName) {
  RegisterActionsInFramework("Kiln", TSampleIDEActions::StaticClass());
  RegisterActionsInFramework("  kiln ", TSampleIDEActions::StaticClass()); // the same class: nothing
  RegisterActionsInFramework("Skein", TSilentIDEActions::StaticClass());
  ExpectActionError([] { RegisterActionsInFramework(" KILN", TSilentIDEActions::StaticClass()); },
                    "The KILN framework is already registered");
  ExpectActionError([] { RegisterActionsInFramework("   ", TSampleIDEActions::StaticClass()); }, "Invalid string");
  ExpectActionError([] { RegisterActionsInFramework("Loom", nullptr); }, "Parameter AIDEActions cannot be nil");
  ExpectActionError([] { (void)GetIDEActionsList(nullptr); }, "Parameter List cannot be nil");

  std::vector<TFrameworkActions> List{{"STALE", nullptr}};
  ASSERT_EQ(GetIDEActionsList(&List), 2);
  EXPECT_EQ(List[0].Key, "KILN");
  EXPECT_EQ(List[0].IDEActions, TSampleIDEActions::StaticClass());
  EXPECT_EQ(List[1].Key, "SKEIN");

  EXPECT_EQ(GetIDEActions("kiln"), TSampleIDEActions::StaticClass());
  EXPECT_EQ(GetIDEActions("nope"), nullptr);
  EXPECT_EQ(GetIDEActions(""), nullptr); // the default, not set here
  vOldIDEActions = TSilentIDEActions::StaticClass();
  auto Restore = Finally([]() noexcept { vOldIDEActions = nullptr; });
  EXPECT_EQ(GetIDEActions(""), TSilentIDEActions::StaticClass());

  // By list: the framework whose list class the list descends from.
  auto* KilnList = CreateComponentOf<TActionList>(Owner.Get());
  auto* LooseList = CreateComponentOf<TContainedActionList>(Owner.Get());
  String Type;
  EXPECT_EQ(GetIDEActions(KilnList, Type), TSampleIDEActions::StaticClass());
  EXPECT_EQ(Type, "KILN");
  Type = "unchanged";
  EXPECT_EQ(GetIDEActions(LooseList, Type), nullptr);
  EXPECT_EQ(Type, "unchanged");

  UnregisterActionsInFramework("kiln");
  UnregisterActionsInFramework("Skein ");
  UnregisterActionsInFramework("absent");
  EXPECT_EQ(GetIDEActionsList(&List), 0);
  EXPECT_TRUE(List.empty());
  // No framework left: a list is looked up by the current project's framework, none here.
  EXPECT_EQ(GetIDEActions(KilnList, Type), TSilentIDEActions::StaticClass());
  EXPECT_EQ(Type, "");
}

//===----------------------------------------------------------------------===//
// Names of new actions
//===----------------------------------------------------------------------===//

TEST_F(ActionEditorsTest, NewActionNamesCarryTheirCategoryOnce) {
  auto Named = [&](TClass C, const String& Category, const String& Framework) {
    auto* A = static_cast<TContainedAction*>(CreateComponent(C, Owner.Get()));
    A->SetCategory(Category);
    return GetNewActionName(A, Framework);
  };
  EXPECT_EQ(Named(TFileOpen::StaticClass(), "File", "Kiln"), "TFileOpen");         // the name holds its category
  EXPECT_EQ(Named(TSearchFind::StaticClass(), "Edit", "Kiln"), "TEditSearchFind"); // it comes in front
  EXPECT_EQ(Named(TAction::StaticClass(), "", "Kiln"), "TAction");
  EXPECT_EQ(Named(TAction::StaticClass(), "File Ops", "Kiln"), "TFileOpsAction");  // blanks go
  EXPECT_EQ(Named(TKilnToolAction::StaticClass(), "Tool", "Kiln"), "TToolAction"); // the framework goes too
  EXPECT_EQ(Named(TKilnToolAction::StaticClass(), "", "kiln"), "TToolAction");     // in any case
  // Too short to lose "T" (not three characters longer): it keeps it.
  EXPECT_EQ(Named(TAb::StaticClass(), "", "Kiln"), "TTAb");
  EXPECT_EQ(Named(TFileOpen::StaticClass(), "FileOpen", "Kiln"), "TFileOpenFileOpen");
  // An action that is not contained keeps its class name.
  auto* Basic = CreateComponentOf<TBasicAction>(Owner.Get());
  EXPECT_EQ(GetNewActionName(Basic, "Kiln"), "TBasicAction");
}

//===----------------------------------------------------------------------===//
// Standard actions
//===----------------------------------------------------------------------===//

TEST_F(ActionEditorsTest, CategoriesMergeWithoutRegardToCaseInOrderOfRegistration) {
  RegisterActionsInFramework("Kiln", TSampleIDEActions::StaticClass());
  int SavedGroup = CurrentGroup;
  auto Restore = Finally([&]() noexcept { CurrentGroup = SavedGroup; });
  CurrentGroup = 3;
  RegActions("File", {TFileOpen::StaticClass(), TComponent::StaticClass()}, nullptr); // no action: left out
  RegActions("Search", {TSearchFind::StaticClass()}, nullptr);
  RegActions("FILE", {TFileSave::StaticClass(), TFileOpen::StaticClass(), TLooseAction::StaticClass()}, nullptr);
  EXPECT_EQ(Notifications, 3);

  const auto& Cats = RegisteredActions();
  ASSERT_EQ(Cats.size(), 2u);
  EXPECT_EQ(Cats[0].Category, "FILE"); // stored as last given
  EXPECT_EQ(ClassesOf(Cats[0]), (std::vector<String>{"TFileOpen", "TFileSave", "TLooseAction"}));
  EXPECT_EQ(Cats[0].Actions[0].Group, 3);
  EXPECT_EQ(ClassesOf(Cats[1]), (std::vector<String>{"TSearchFind"}));
  EXPECT_EQ(GetClass("TFileSave"), TFileSave::StaticClass()); // registered for streaming

  // Enumeration gives the framework's actions only, category by category.
  EXPECT_EQ(Enumerated("kiln"), (std::vector<String>{"FILE:TFileOpen", "FILE:TFileSave", "Search:TSearchFind"}));
  EXPECT_TRUE(Enumerated("nope").empty());
  RegisterActionsInFramework("Skein", TSilentIDEActions::StaticClass());
  EXPECT_TRUE(Enumerated("Skein").empty()); // no base class
  UnRegisterClass(TFileOpen::StaticClass());
  UnRegisterClass(TFileSave::StaticClass());
  UnRegisterClass(TSearchFind::StaticClass());
  UnRegisterClass(TLooseAction::StaticClass());
}

TEST_F(ActionEditorsTest, UnregisteredActionsKeepTheirSlotsUntilACategoryIsEmpty) {
  RegisterActionsInFramework("Kiln", TSampleIDEActions::StaticClass());
  int SavedGroup = CurrentGroup;
  auto Restore = Finally([&]() noexcept { CurrentGroup = SavedGroup; });
  CurrentGroup = 5;
  RegActions("File", {TFileOpen::StaticClass(), TFileSave::StaticClass()}, nullptr);
  CurrentGroup = 6;
  RegActions("Search", {TSearchFind::StaticClass()}, nullptr);

  UnRegActions({TFileOpen::StaticClass()});
  EXPECT_EQ(Notifications, 3);
  const auto& Cats = RegisteredActions();
  EXPECT_EQ(ClassesOf(Cats[0]), (std::vector<String>{"nil", "TFileSave"}));
  EXPECT_EQ(Cats[0].Actions[0].Group, -1);
  EXPECT_EQ(Enumerated("Kiln"), (std::vector<String>{"File:TFileSave", "Search:TSearchFind"}));

  // The package of group 6 goes: its registrations with it.
  NotifyGroupChangeSubscribers(6);
  EXPECT_EQ(Notifications, 4);
  EXPECT_EQ(ClassesOf(Cats[1]), (std::vector<String>{"nil"}));
  UnRegActions({TFileSave::StaticClass()});
  EXPECT_TRUE(Enumerated("Kiln").empty());
  // Enumeration cleared the dead categories' entries; their names stay.
  ASSERT_EQ(Cats.size(), 2u);
  EXPECT_TRUE(Cats[0].Actions.empty());
  EXPECT_TRUE(Cats[1].Actions.empty());
  EXPECT_EQ(Cats[1].Category, "Search");
  // Registering into a category again reuses its record.
  RegActions("search", {TSearchFind::StaticClass()}, nullptr);
  ASSERT_EQ(Cats.size(), 2u);
  EXPECT_EQ(ClassesOf(Cats[1]), (std::vector<String>{"TSearchFind"}));
  for (TClass C : {TFileOpen::StaticClass(), TFileSave::StaticClass(), TSearchFind::StaticClass()}) UnRegisterClass(C);
}

TEST_F(ActionEditorsTest, NewActionsAreFilledFromTheirResourcesPrototype) {
  TFileResource::Made = 0;
  RegActions("File", {TFileOpen::StaticClass()}, TFileResource::StaticClass());
  RegActions("Search", {TSearchFind::StaticClass()}, nullptr);

  // Without a framework: the prototype's visible state is copied, not its category.
  auto* Open = static_cast<TContainedAction*>(CreateAction(Owner.Get(), TFileOpen::StaticClass(), ""));
  EXPECT_EQ(Open->Owner(), Owner.Get());
  EXPECT_EQ(Open->Caption(), "&Open...");
  EXPECT_EQ(Open->Hint(), "Open|Opens a file");
  EXPECT_EQ(Open->ShortCut(), 0x4000 | 'O');
  EXPECT_EQ(Open->ImageIndex(), 7);
  EXPECT_TRUE(Open->Checked());
  EXPECT_EQ(Open->Category(), "");
  // With a framework, its `AssignAction` decides: the base copies the category alone.
  RegisterActionsInFramework("Kiln", TSampleIDEActions::StaticClass());
  auto* Framed = static_cast<TContainedAction*>(CreateAction(Owner.Get(), TFileOpen::StaticClass(), "Kiln"));
  EXPECT_EQ(Framed->Category(), "Files");
  EXPECT_EQ(Framed->Caption(), "");
  EXPECT_EQ(TFileResource::Made, 1); // one instance, cached

  // Without a resource the action is plain.
  auto* Find = static_cast<TContainedAction*>(CreateAction(Owner.Get(), TSearchFind::StaticClass(), "Kiln"));
  EXPECT_EQ(Find->Caption(), "");
  // Registering again adds nothing but renews the resource.
  RegActions("File", {TFileOpen::StaticClass()}, TFileResource::StaticClass());
  EXPECT_EQ(RegisteredActions()[0].Actions.size(), 1u);
  (void)CreateAction(Owner.Get(), TFileOpen::StaticClass(), "");
  EXPECT_EQ(TFileResource::Made, 2);

  int Before = Owner->ComponentCount();
  ExpectActionError([&] { (void)CreateAction(Owner.Get(), TComponent::StaticClass(), ""); },
                    "The created action, must inherit from TContainedAction");
  // A prototype that is no action: refused, and the new action goes again.
  RegActions("File", {TFileSave::StaticClass()}, TBrokenResource::StaticClass());
  ExpectActionError([&] { (void)CreateAction(Owner.Get(), TFileSave::StaticClass(), ""); },
                    "The created action, must inherit from TContainedAction");
  EXPECT_EQ(Owner->ComponentCount(), Before);
  for (TClass C : {TFileOpen::StaticClass(), TFileSave::StaticClass(), TSearchFind::StaticClass()}) UnRegisterClass(C);
}

TEST_F(ActionEditorsTest, TheRuntimesHooksReachTheRegistryOnlyOnceInstalled) {
  ExpectActionError([] { RegisterActions("File", {TFileOpen::StaticClass()}, nullptr); },
                    "No action registry is installed");
  ExpectActionError([] { UnRegisterActions({TFileOpen::StaticClass()}); }, "No action registry is installed");
  ExpectActionError([&] { (void)CreateRegisteredAction(Owner.Get(), TFileOpen::StaticClass(), ""); },
                    "No action registry is installed");
  int Calls = 0;
  EnumRegisteredActions([&](const String&, TClass, void*) { ++Calls; }, nullptr, "Kiln");
  EXPECT_TRUE(RegisteredActions().empty());

  InstallActionHooks();
  RegisterActionsInFramework("Kiln", TSampleIDEActions::StaticClass());
  RegisterActions("File", {TFileOpen::StaticClass()}, TFileResource::StaticClass());
  int Info = 42;
  EnumRegisteredActions(
      [&](const String& Category, TClass C, void* I) {
        ++Calls;
        EXPECT_EQ(Category, "File");
        EXPECT_EQ(C, TFileOpen::StaticClass());
        EXPECT_EQ(I, &Info);
      },
      &Info, "Kiln");
  EXPECT_EQ(Calls, 1);
  TBasicAction* A = CreateRegisteredAction(Owner.Get(), TFileOpen::StaticClass(), "");
  EXPECT_EQ(static_cast<TContainedAction*>(A)->Caption(), "&Open...");
  UnRegisterActions({TFileOpen::StaticClass()});
  EXPECT_EQ(RegisteredActions()[0].Actions[0].ActionClass, nullptr);
  UnRegisterClass(TFileOpen::StaticClass());
}

} // namespace
} // namespace formkit
