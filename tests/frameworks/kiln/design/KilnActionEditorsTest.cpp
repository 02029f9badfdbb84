//===- tests/frameworks/kiln/design/KilnActionEditorsTest.cpp - Kiln's actions on design ===//
//
// What the Kiln design package gives the action registries once the core
// runs: the framework "Kiln", its standard edit actions with their
// prototypes, the runtime's hooks; and a new standard action made and named
// on a module as the action editor makes it.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/KilnActionEditors.h"
#include "editors/EditorRegistry.h"
#include "frameworks/kiln/KilnClipbrd.h"
#include "frameworks/kiln/KilnDialogs.h"
#include "platform/ScopeGuard.h"
#include "tools/ToolsAPI.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

using KilnActionEditorsTest = KilnDesignFixture;

/// A control that runs an action.
class TActionClient : public TGraphicControl {
  FK_CLASS(TActionClient, TGraphicControl)
  void BeforeDestruction() override {
    SetAction(nullptr);
    inherited::BeforeDestruction();
  }
  TContainedAction* Action() const { return FAction; }
  void SetAction(TContainedAction* Value) {
    if (FAction) RemoveFreeNotification(FAction);
    FAction = Value;
    if (Value) FreeNotification(Value);
  }
  void Notification(TComponent* AComponent, TOperation Operation) override {
    inherited::Notification(AComponent, Operation);
    if (Operation == opRemove && AComponent == FAction) FAction = nullptr;
  }

private:
  TContainedAction* FAction = nullptr;
};
FK_IMPLEMENT(TActionClient, "KilnActionEditorsTest") {
  B.Property("Action", &TActionClient::Action, &TActionClient::SetAction);
}

/// The inspector's side of a drop-down: records what it is asked.
class TRecordingHost : public TInterfacedObject, public IPropertyHost, public IPropertyHost20 {
  FK_CLASS(TRecordingHost, TInterfacedObject)
  FK_INTERFACES(IPropertyHost, IPropertyHost20)
  void DropDownControl(TComponent* Control) override { Calls.push_back("DropDown " + Control->ClassName()); }
  void CloseDropDown() override { Calls.push_back("Close"); }
  int GetDropDownWidth() override { return 150; }
  std::vector<String> Calls;
};
FK_IMPLEMENT(TRecordingHost, "KilnActionEditorsTest") {}

String KilnFramework() { return "Kiln"; }

/// An open module of the host that is neither project nor group.
class THostModule : public TInterfacedObject, public IOTAModule {
  FK_CLASS(THostModule, TInterfacedObject)
  FK_INTERFACES(IOTAModule)
  String GetFileName() override { return String(); }
  int GetModuleFileCount() override { return 0; }
  String GetModuleFileName(int) override { return String(); }
  int AddNotifier(const IPtr<IOTAModuleNotifier>&) override { return -1; }
  void RemoveNotifier(int) override {}
  IPtr<IOTAEditor> GetModuleFileEditor(int) override { return nullptr; }
  bool Save(bool, bool) override { return false; }
  bool CloseModule(bool) override { return false; }
  void SetFileName(const String&) override {}
  void SetFileSystem(const String&) override {}
};
FK_IMPLEMENT(THostModule, "KilnActionEditorsTest") {}

/// A project of a framework.
class THostProject : public THostModule, public IOTAProject {
  FK_CLASS(THostProject, THostModule)
  FK_INTERFACES(IOTAProject)
  String GetFrameworkType() override { return Framework; }
  String Framework;
};
FK_IMPLEMENT(THostProject, "KilnActionEditorsTest") {}

/// A group of projects whose active one is `Active`.
class THostGroup : public THostModule, public IOTAProjectGroup {
  FK_CLASS(THostGroup, THostModule)
  FK_INTERFACES(IOTAProjectGroup)
  int GetProjectCount() override { return Projects; }
  IPtr<IOTAProject> GetActiveProject() override { return Active; }
  int Projects = 0;
  IPtr<IOTAProject> Active;
};
FK_IMPLEMENT(THostGroup, "KilnActionEditorsTest") {}

/// The host's services: its open modules and main project group.
class THostServices : public TInterfacedObject, public IHalvernIDEServices, public IOTAModuleServices {
  FK_CLASS(THostServices, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTAModuleServices)
  int AddFileSystem(const IPtr<IOTAFileSystem>&) override { return -1; }
  IPtr<IOTAModule> CreateModule(const IPtr<IOTACreator>&) override { return nullptr; }
  IPtr<IOTAModule> FindModule(const String&) override { return nullptr; }
  int GetModuleCount() override { return static_cast<int>(Modules.size()); }
  IPtr<IOTAModule> GetModule(int Index) override { return InterfaceOf<IOTAModule>(Modules.at(Index).Get()); }
  IPtr<IOTAProjectGroup> GetMainProjectGroup() override {
    return MainGroup ? InterfaceOf<IOTAProjectGroup>(MainGroup.Get()) : nullptr;
  }
  void RemoveFileSystem(int) override {}
  IPtr<IOTAProject> GetActiveProject() override { return nullptr; }
  std::vector<IPtr<THostModule>> Modules;
  IPtr<THostGroup> MainGroup;
};
FK_IMPLEMENT(THostServices, "KilnActionEditorsTest") {}

IPtr<THostProject> Project(const String& Framework) {
  IPtr<THostProject> M = New<THostProject>();
  M->Framework = Framework;
  return M;
}

IPtr<THostGroup> Group(int Projects, const IPtr<THostProject>& Active) {
  IPtr<THostGroup> M = New<THostGroup>();
  M->Projects = Projects;
  M->Active = Active ? InterfaceOf<IOTAProject>(Active.Get()) : nullptr;
  return M;
}

/// The rows of a view, "|"-joined.
String RowsOf(const TActionListView* View) {
  String Rows;
  for (int I = 0; I < View->RowCount(); ++I) Rows += (I ? "|" : "") + View->RowCaption(I);
  return Rows;
}

/// The captions of the items under `Item`, "|"-joined, each with its own items in brackets.
String MenuOf(const TMenuItem* Item) {
  String Text;
  for (int I = 0; I < Item->Count(); ++I) {
    Text += (I ? "|" : "") + Item->Items(I)->Caption();
    if (Item->Items(I)->Count()) Text += "[" + MenuOf(Item->Items(I)) + "]";
  }
  return Text;
}

TEST_F(KilnActionEditorsTest, TheKilnFrameworkAndItsStandardActionsAreRegistered) {
  EXPECT_EQ(GetIDEActions("kiln"), TKilnIDEActions::StaticClass());
  TObjectGuard<TIDEActions> Kiln = IDEActionsOf(GetIDEActions("Kiln"));
  EXPECT_EQ(Kiln->DefaultActionClass(), TAction::StaticClass());
  EXPECT_EQ(Kiln->BaseActionListClass(), TActionList::StaticClass());
  std::vector<String> Seen;
  EnumRegisteredActions([&](const String& Category, TClass C, void*) { Seen.push_back(Category + ":" + C->ClassName); },
                        nullptr, "Kiln");
  EXPECT_EQ(Seen, (std::vector<String>{"Edit:TEditCut", "Edit:TEditCopy", "Edit:TEditPaste", "Edit:TEditDelete"}));
  EXPECT_EQ(GetClass("TEditCopy"), TEditCopy::StaticClass()); // a module can stream them
  // Without a host's project the framework is not known.
  EXPECT_EQ(GetFrameworkType(), "");
}

TEST_F(KilnActionEditorsTest, TheFrameworkIsThatOfTheHostsCurrentProject) {
  EXPECT_EQ(ProjectFrameworkType(), ""); // no host services
  IPtr<THostServices> Host = New<THostServices>();
  HalvernIDEServices = IPtr<IHalvernIDEServices>(Host);
  auto Restore = Finally([]() noexcept { HalvernIDEServices = nullptr; });
  EXPECT_EQ(ProjectFrameworkType(), "");
  // The one project of the main group.
  Host->MainGroup = Group(1, Project("Skein"));
  EXPECT_EQ(GetFrameworkType(), "Skein");
  // Otherwise the open modules: one project, or the active project of the first group.
  Host->MainGroup = Group(2, Project("Skein"));
  Host->Modules = {New<THostModule>(), IPtr<THostModule>(Project("Kiln"))};
  EXPECT_EQ(ProjectFrameworkType(), "Kiln");
  String Type;
  EXPECT_EQ(GetIDEActions(nullptr, Type), TKilnIDEActions::StaticClass());
  EXPECT_EQ(Type, "Kiln");
  Host->Modules.push_back(IPtr<THostModule>(Project("Loom")));
  EXPECT_EQ(ProjectFrameworkType(), ""); // two projects: which one is not known
  Host->Modules.insert(Host->Modules.begin() + 1, IPtr<THostModule>(Group(3, Project("Kiln"))));
  EXPECT_EQ(ProjectFrameworkType(), "Kiln"); // the group ends the walk
  Host->Modules = {IPtr<THostModule>(Group(3, nullptr)), IPtr<THostModule>(Project("Kiln"))};
  EXPECT_EQ(ProjectFrameworkType(), "");
  Host->MainGroup = nullptr;
  Host->Modules.clear();
}

TEST_F(KilnActionEditorsTest, AStandardActionIsMadeFromItsPrototypeAndNamedOnTheModule) {
  IPtr<IRoot> Form = NewForm("Form1");
  TComponent* Root = Form->GetRoot();
  IPtr<IDesigner> Designer = QueryAs<IDesigner>(Form);
  auto* List = static_cast<TActionList*>(KilnRoot(Form)->CreateComponent(TActionList::StaticClass(), Root, 8, 8, 0, 0));

  auto* Copy = dynamic_cast<TEditCopy*>(CreateRegisteredAction(Root, TEditCopy::StaticClass(), "Kiln"));
  ASSERT_TRUE(Copy);
  EXPECT_EQ(Copy->Owner(), Root);
  EXPECT_EQ(Copy->Caption(), "&Copy");
  EXPECT_EQ(Copy->Category(), "Edit");
  EXPECT_EQ(Copy->Hint(), "Copy|Copies the text and puts it on the Clipboard");
  EXPECT_EQ(Copy->ShortCut(), 0x4000 | 'C');
  String Name = GetNewActionName(Copy, "Kiln");
  EXPECT_EQ(Name, "TEditCopy");
  Copy->SetName(Designer->UniqueName(Name));
  EXPECT_EQ(Copy->Name(), "EditCopy1");
  Copy->SetActionList(List);
  EXPECT_EQ(List->Actions(0), Copy);
  String Type;
  EXPECT_EQ(GetIDEActions(List, Type), TKilnIDEActions::StaticClass());
  EXPECT_EQ(Type, "KILN");

  // It works on its edit.
  auto* Edit = static_cast<TEdit*>(KilnRoot(Form)->CreateComponent(TEdit::StaticClass(), Root, 8, 40, 121, 23));
  Edit->SetText("hello");
  EXPECT_FALSE(Copy->Execute()); // no edit yet
  Copy->SetControl(Edit);
  EXPECT_TRUE(Copy->Execute());
  EXPECT_EQ(Clipboard()->AsText(), "hello");
  auto* Cut = static_cast<TEditCut*>(CreateRegisteredAction(Root, TEditCut::StaticClass(), "Kiln"));
  Cut->SetControl(Edit);
  Edit->SetText("cut me");
  EXPECT_TRUE(Cut->Execute());
  EXPECT_EQ(Edit->Text(), "");
  auto* Paste = static_cast<TEditPaste*>(CreateRegisteredAction(Root, TEditPaste::StaticClass(), "Kiln"));
  Paste->SetControl(Edit);
  Edit->SetReadOnly(true);
  EXPECT_TRUE(Paste->Execute());
  EXPECT_EQ(Edit->Text(), ""); // read-only
  Edit->SetReadOnly(false);
  EXPECT_TRUE(Paste->Execute());
  EXPECT_EQ(Edit->Text(), "cut me");
  Edit->Destroy(); // the actions forget it
  EXPECT_EQ(Paste->Control(), nullptr);
  EXPECT_FALSE(Paste->Execute());
}

TEST_F(KilnActionEditorsTest, TheActionPropertyDropsDownTheModulesActionsAndCreatesNewOnes) {
  IPtr<IRoot> Form = NewForm("Form1");
  TComponent* Root = Form->GetRoot();
  IPtr<IDesigner> Designer = QueryAs<IDesigner>(Form);
  auto* Client =
      static_cast<TActionClient*>(KilnRoot(Form)->CreateComponent(TActionClient::StaticClass(), Root, 8, 8, 20, 20));
  PPropInfo ActionProp = GetPropInfo(Client, "Action");
  ASSERT_EQ(GetEditorClass(ActionProp, Client), TActionProperty::StaticClass());
  TNewPropertyEditor E = NewPropertyEditor(TActionProperty::StaticClass(), Designer, 1);
  E.Editor->SetPropEntry(0, Client, ActionProp);
  E.Editor->Initialize();
  IPtr<IProperty80> Prop = QueryAs<IProperty80>(E.Prop);
  ASSERT_TRUE(Prop);
  TPropertyAttributes A = Prop->GetAttributes();
  EXPECT_TRUE(A.Contains(paCustomDropDown) && A.Contains(paVolatileSubProperties));
  EXPECT_FALSE(A.Contains(paValueList) || A.Contains(paSortList));
  auto* Editor = dynamic_cast<TActionProperty*>(E.Editor.Get());
  IPtr<TRecordingHost> Host = New<TRecordingHost>();

  // No project, no framework: the one row says why, and a click shows it.
  Prop->Edit(InterfaceOf<IPropertyHost>(Host.Get()), false);
  TActionListView* View = Editor->ActionListView();
  EXPECT_EQ(Host->Calls, (std::vector<String>{"DropDown TActionListView"}));
  EXPECT_EQ(RowsOf(View), "You cannot set property... ");
  EXPECT_EQ(View->Msg(), "Actions not implemented for the current framework ''");
  DialogScript().Answer(mrOk);
  View->ClickRow(0);
  ASSERT_EQ(DialogScript().Shown().size(), 1u);
  EXPECT_EQ(DialogScript().Shown()[0].Caption, "You cannot set property...");
  EXPECT_EQ(DialogScript().Shown()[0].Message, "Actions not implemented for the current framework ''");
  DialogScript().Clear();

  // A Kiln project without an action list.
  GetFrameworkTypeProc = &KilnFramework;
  auto Restore = Finally([]() noexcept { GetFrameworkTypeProc = &ProjectFrameworkType; });
  Prop->Edit(InterfaceOf<IPropertyHost>(Host.Get()), false);
  View = Editor->ActionListView();
  EXPECT_EQ(View->Msg(), "Instances of TActionList are not found in the current units");
  EXPECT_EQ(MenuOf(View->NewStdActionMenu()->Items()), "You cannot set property...");

  // With one list, "New Action" creates a plain action in it at once and selects it.
  auto* List =
      static_cast<TActionList*>(KilnRoot(Form)->CreateComponent(TActionList::StaticClass(), Root, 8, 40, 0, 0));
  Prop->Edit(InterfaceOf<IPropertyHost>(Host.Get()), false);
  View = Editor->ActionListView();
  EXPECT_EQ(View->Width(), 150);
  EXPECT_EQ(RowsOf(View), "New Action|New Standard Action");
  EXPECT_EQ(View->ActionList(), List);
  EXPECT_EQ(MenuOf(View->NewStdActionMenu()->Items()), "Edit[TEditCut|TEditCopy|TEditPaste|TEditDelete]");
  Host->Calls.clear();
  View->ClickRow(0);
  ASSERT_TRUE(Client->Action());
  EXPECT_EQ(Client->Action()->Name(), "Action1");
  EXPECT_EQ(Client->Action()->ClassType(), TAction::StaticClass());
  EXPECT_EQ(Client->Action()->ActionList(), List);
  EXPECT_EQ(Prop->GetValue(), "Action1");
  EXPECT_EQ(Host->Calls, (std::vector<String>{"Close"}));

  // A standard action from the menu: named by its class, filled from its prototype.
  Prop->Edit(InterfaceOf<IPropertyHost>(Host.Get()), false);
  View = Editor->ActionListView();
  EXPECT_EQ(RowsOf(View), "New Action|New Standard Action|-|Action1");
  EXPECT_EQ(View->Height(), 80);
  View->ClickRow(1);
  EXPECT_EQ(View->NewStdActionMenu()->PopupCount(), 1);
  View->NewStdActionMenu()->Items()->Items(0)->Items(1)->Click();
  auto* Copy = dynamic_cast<TEditCopy*>(Client->Action());
  ASSERT_TRUE(Copy);
  EXPECT_EQ(Copy->Name(), "EditCopy1");
  EXPECT_EQ(Copy->Category(), "Edit");
  EXPECT_EQ(Copy->Caption(), "&Copy");
  EXPECT_EQ(List->ActionCount(), 2);

  // Choosing a row, then a click below the rows, which clears the property.
  Prop->Edit(InterfaceOf<IPropertyHost>(Host.Get()), false);
  View = Editor->ActionListView();
  EXPECT_EQ(RowsOf(View), "New Action|New Standard Action|-|Action1|EditCopy1");
  View->ClickRow(3);
  EXPECT_EQ(Client->Action()->Name(), "Action1");
  View->SetSelectedRow(4);
  View->KeyDown(0x0D);
  EXPECT_EQ(Client->Action(), Copy);
  View->ClickRow(2); // the separator
  EXPECT_EQ(Client->Action(), Copy);
  View->ClickRow(-1);
  EXPECT_EQ(Client->Action(), nullptr);

  // Two lists: "New Action" asks which one.
  auto* Second =
      static_cast<TActionList*>(KilnRoot(Form)->CreateComponent(TActionList::StaticClass(), Root, 8, 80, 0, 0));
  Prop->Edit(InterfaceOf<IPropertyHost>(Host.Get()), false);
  View = Editor->ActionListView();
  EXPECT_EQ(View->ActionList(), nullptr);
  EXPECT_EQ(MenuOf(View->NewActionMenu()->Items()), "ActionList1|ActionList2");
  View->ClickRow(0);
  EXPECT_EQ(View->NewActionMenu()->PopupCount(), 1);
  View->NewActionMenu()->Items()->Items(1)->Click();
  ASSERT_TRUE(Client->Action());
  EXPECT_EQ(Client->Action()->ActionList(), Second);
  EXPECT_EQ(Client->Action()->Name(), "Action2");
}

} // namespace
