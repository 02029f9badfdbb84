//===- frameworks/kiln/design/KilnActionEditors.cpp - Kiln's actions on design ===//
#include "frameworks/kiln/design/KilnActionEditors.h"

#include "core/DesignCore.h"
#include "core/DesignIntfClasses.h"
#include "core/ToolServices.h"
#include "frameworks/kiln/KilnDialogs.h"
#include "platform/ScopeGuard.h"
#include "tools/ToolsAPI.h"

#include <algorithm>

namespace formkit {

namespace {

void StartKilnActions() {
  InstallActionHooks();
  GetFrameworkTypeProc = &ProjectFrameworkType;
  RegisterActionsInFramework(KilnFrameworkType, TKilnIDEActions::StaticClass());
  RegisterActions("Edit", StandardActionClasses(), TStandardActions::StaticClass());
}

void StopKilnActions() {
  if (UnRegisterActionsProc) UnRegisterActions(StandardActionClasses());
  UnregisterActionsInFramework(KilnFrameworkType);
  GetFrameworkTypeProc = nullptr;
}

/// The project the walk over the open modules finds, or null.
IPtr<IOTAProject> ProjectOfOpenModules(IOTAModuleServices& Modules) {
  IPtr<IOTAProject> Kept;
  for (int I = 0; I < Modules.GetModuleCount(); ++I) {
    IPtr<IOTAModule> Module = Modules.GetModule(I);
    if (IPtr<IOTAProjectGroup> Group = QueryAs<IOTAProjectGroup>(Module)) return Group->GetActiveProject();
    if (IPtr<IOTAProject> Project = QueryAs<IOTAProject>(Module)) {
      if (Kept) return nullptr; // two projects: which one is meant is not known
      Kept = Project;
    }
  }
  return Kept;
}

} // namespace

FK_IMPLEMENT(TKilnIDEActions, "KilnActionEditors") {}

void TKilnIDEActions::AssignAction(TBasicAction* Source, TBasicAction* Dest) {
  inherited::AssignAction(Source, Dest);
  auto* From = dynamic_cast<TContainedAction*>(Source);
  auto* To = dynamic_cast<TContainedAction*>(Dest);
  if (From && To) CopyActionProperties(From, To);
}

String ProjectFrameworkType() {
  IPtr<IOTAModuleServices> Modules = QueryAs<IOTAModuleServices>(HalvernIDEServices);
  if (!Modules) return String();
  IPtr<IOTAProject> Project;
  IPtr<IOTAProjectGroup> Main = Modules->GetMainProjectGroup();
  if (Main && Main->GetProjectCount() == 1)
    Project = Main->GetActiveProject();
  else
    Project = ProjectOfOpenModules(*Modules);
  return Project ? Project->GetFrameworkType() : String();
}

//===----------------------------------------------------------------------===//
// TActionListView
//===----------------------------------------------------------------------===//

namespace {

/// The rows before the actions: "New Action", "New Standard Action", the separator.
constexpr int FirstActionRow = 3;
constexpr int MaxShownRows = 14;
constexpr int VirtualKeyReturn = 0x0D;
constexpr int VirtualKeyRight = 0x27;

} // namespace

FK_IMPLEMENT(TActionListView, "KilnActionEditors") {}

void TActionListView::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FFrameworkType = GetFrameworkType();
  FIDEActions = GetIDEActions(FFrameworkType);
  FNewActnPopupMenu = CreateComponentOf<TPopupMenu>(this);
  FNewStdActnPopupMenu = CreateComponentOf<TPopupMenu>(this);
  SetBounds(Left(), Top(), ScaleValue(200), ScaleValue(20));
}

std::vector<TContainedActionList*> TActionListView::FindActionLists() const {
  std::vector<TContainedActionList*> Lists;
  TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(FIDEActions);
  TClass ListClass = IDEActions ? IDEActions->BaseActionListClass() : nullptr;
  if (!FDesigner || !ListClass) return Lists;
  FDesigner->GetComponentNames(GetTypeData(ListClass->TypeInfo()), [&](const String& Name) {
    if (auto* List = dynamic_cast<TContainedActionList*>(FDesigner->GetComponent(Name))) Lists.push_back(List);
  });
  return Lists;
}

void TActionListView::SetDesigner(const IPtr<IDesigner>& Designer) {
  if (Designer.Get() == FDesigner.Get()) return;
  FDesigner = Designer;
  FActions.clear();
  TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(FIDEActions);
  TClass Base = IDEActions ? IDEActions->BaseActionClass() : nullptr;
  if (FDesigner && Base)
    FDesigner->GetComponentNames(GetTypeData(Base->TypeInfo()), [&](const String& Name) {
      TComponent* C = FDesigner->GetComponent(Name);
      auto* Action = dynamic_cast<TContainedAction*>(C);
      if (C && !Action) throw Exception(SActionMustInherit, Base->ClassName);
      if (Action && Action->InheritsFrom(Base)) FActions.push_back(Action);
    });
  int Count = static_cast<int>(FActions.size());
  SetHeight(Count > 0 ? ScaleValue(20) * (std::min(Count, 11) + FirstActionRow) : ScaleValue(20));
  RebuildPopupMenus();
  RebuildListView();
}

String TActionListView::ListCaption(TContainedActionList* List, bool Several) const {
  if (!Several) return List->Name();
  if (FDesigner && List->Owner() == FDesigner->GetRoot()) return List->Name();
  return (List->Owner() ? List->Owner()->Name() : String()) + "." + List->Name();
}

TMenuItem* TActionListView::AddItem(TMenuItem* Parent, const String& Caption, TContainedActionList* List,
                                    TClass ActionClass, TNotifyEvent OnClick) {
  FTags.reserve(FTags.size() + 1);
  auto* Item = CreateComponentOf<TMenuItem>(this);
  Item->SetCaption(Caption);
  Item->OnClick = OnClick;
  Parent->Add(Item);
  FTags.push_back(TItemTag{Item, List, ActionClass});
  return Item;
}

const TActionListView::TItemTag* TActionListView::TagOf(TObject* Item) const {
  for (const TItemTag& T : FTags)
    if (T.Item == Item) return &T;
  return nullptr;
}

void TActionListView::RebuildPopupMenus() {
  FMsg.clear();
  FStdActionList.clear();
  for (TItemTag& T : FTags) T.Item->Destroy();
  FTags.clear();
  EnumRegisteredActions(
      [this](const String& Category, TClass C, void*) {
        String Name = Category.empty() ? LoadResString(SActionCategoryNone) : Category;
        auto At = std::find_if(FStdActionList.begin(), FStdActionList.end(),
                               [&](const auto& Entry) { return Entry.first == Name; });
        if (At == FStdActionList.end()) At = FStdActionList.insert(At, {Name, {}});
        At->second.push_back(C);
      },
      nullptr, FFrameworkType);

  TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(FIDEActions);
  std::vector<TContainedActionList*> Lists = FindActionLists();
  if (!IDEActions)
    FMsg = Format(LoadResString(SNoActionsImpl), FFrameworkType);
  else if (!IDEActions->BaseActionListClass())
    FMsg = LoadResString(SNoDefineBase);
  else if (Lists.empty())
    FMsg = Format(LoadResString(SNoActionLists), IDEActions->BaseActionListClass()->ClassName);
  FActionList = Lists.size() == 1 ? Lists.front() : nullptr;
  if (!FMsg.empty()) {
    AddItem(FNewStdActnPopupMenu->Items(), LoadResString(SCannotSetProperty), nullptr, nullptr,
            TNotifyEvent::Bind<&TActionListView::DoShowMsgClick>(this));
    return;
  }
  bool Several = Lists.size() > 1;
  for (TContainedActionList* List : Lists) {
    TMenuItem* Under = FNewStdActnPopupMenu->Items();
    if (Several) {
      AddItem(FNewActnPopupMenu->Items(), ListCaption(List, true), List, nullptr,
              TNotifyEvent::Bind<&TActionListView::DoNewActionClick>(this));
      Under = AddItem(Under, ListCaption(List, true), List, nullptr);
    }
    for (const auto& [Category, Classes] : FStdActionList) {
      TMenuItem* CategoryItem = AddItem(Under, Category, List, nullptr);
      for (TClass C : Classes)
        AddItem(CategoryItem, C->ClassName, List, C, TNotifyEvent::Bind<&TActionListView::DoNewStdActionClick>(this));
    }
  }
}

void TActionListView::RebuildListView() {
  FRows.clear();
  if (!FMsg.empty()) {
    FRows.push_back(TRow{LoadResString(SCannotSetProperty) + " ", nullptr});
  } else {
    FRows.push_back(TRow{LoadResString(SCreateNewAction), nullptr});
    FRows.push_back(TRow{LoadResString(SCreateNewStdAction), nullptr});
    std::vector<TContainedAction*> Sorted = FActions;
    std::sort(Sorted.begin(), Sorted.end(),
              [](TContainedAction* A, TContainedAction* B) { return CompareText(A->Name(), B->Name()) < 0; });
    if (!Sorted.empty()) FRows.push_back(TRow{"-", nullptr});
    for (TContainedAction* A : Sorted) FRows.push_back(TRow{A->Name(), A});
  }
  TObjectGuard<TCanvas> Measure(new TCanvas);
  int Width = this->Width();
  for (std::size_t I = 0; I < FRows.size(); ++I) {
    int Extra = FRows[I].Action ? ScaleValue(40) : I == 0 ? ScaleValue(25) : 0;
    Width = std::max(Width, Measure->TextWidth(FRows[I].Caption) + Extra);
  }
  int Rows = static_cast<int>(FRows.size());
  int Height = ScaleValue(20) * std::min(Rows, MaxShownRows);
  if (Rows > MaxShownRows) Width += ScaleValue(16); // the vertical scroll bar
  SetBounds(Left(), Top(), Width, Rows == 0 ? ScaleValue(20) : Height);
}

void TActionListView::ShowPopupMenu(int Row, TPopupMenu* Menu) {
  TPoint At = ClientToScreen(Point(Width(), Row * ScaleValue(20)));
  Menu->Popup(At.X, At.Y);
}

void TActionListView::DoShowMsg() {
  if (FMsg.empty()) return;
  TObjectGuard<TCustomForm> Dialog = CreateMessageDialog(FMsg, mtWarning, TMsgDlgButtons{mbOK});
  Dialog->SetCaption(LoadResString(SCannotSetProperty));
  (void)ShowMessageDialog(Dialog.Get(), mtWarning);
}

void TActionListView::DoShowMsgClick(TObject*) { DoShowMsg(); }

void TActionListView::DoNewActionClick(TObject* Sender) {
  TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(FIDEActions);
  const TItemTag* Tag = TagOf(Sender);
  if (IDEActions && IDEActions->DefaultActionClass() && OnNewAction)
    OnNewAction(this, String(), IDEActions->DefaultActionClass(), Tag ? Tag->List : nullptr);
}

void TActionListView::DoNewStdActionClick(TObject* Sender) {
  const TItemTag* Tag = TagOf(Sender);
  if (Tag && OnNewAction) OnNewAction(this, String(), Tag->ActionClass, Tag->List);
}

void TActionListView::ClickRow(int Row) {
  if (Row < 0 || Row >= RowCount()) {
    if (OnSelectAction) OnSelectAction(this, nullptr);
    return;
  }
  if (Row == 0) {
    if (!FMsg.empty()) return DoShowMsg();
    if (FNewActnPopupMenu->Items()->Count() == 0) {
      TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(FIDEActions);
      if (OnNewAction && IDEActions && IDEActions->DefaultActionClass())
        OnNewAction(this, String(), IDEActions->DefaultActionClass(), FActionList);
      return;
    }
    return ShowPopupMenu(Row, FNewActnPopupMenu);
  }
  if (Row == 1) return ShowPopupMenu(Row, FNewStdActnPopupMenu);
  if (Row == 2) return;
  TContainedAction* Action = RowAction(Row);
  if (!Action) throw Exception(SActionMustInherit, TContainedAction::StaticClass()->ClassName);
  if (OnSelectAction) OnSelectAction(this, Action);
}

void TActionListView::KeyDown(int Key) {
  if (Key == VirtualKeyReturn && OnSelectAction)
    ClickRow(FSelected);
  else if (Key == VirtualKeyRight)
    ShowPopupMenu(FSelected, FSelected == 0 ? FNewActnPopupMenu : FNewStdActnPopupMenu);
}

//===----------------------------------------------------------------------===//
// TActionProperty
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TActionProperty, "KilnActionEditors") {}

void TActionProperty::BeforeDestruction() {
  FActionListView.Reset();
  FHost = nullptr;
  inherited::BeforeDestruction();
}

TPropertyAttributes TActionProperty::GetAttributes() {
  TPropertyAttributes A = inherited::GetAttributes();
  A.Exclude(paValueList);
  A.Exclude(paSortList);
  A.Include(paVolatileSubProperties);
  A.Include(paCustomDropDown);
  return A;
}

void TActionProperty::Edit(const IPtr<IPropertyHost>& Host, bool) {
  FHost = Host;
  FActionListView.Reset();
  FActionListView.Reset(CreateComponentOf<TActionListView>(nullptr));
  TActionListView* View = FActionListView.Get();
  if (IPtr<IPropertyHost20> Host20 = QueryAs<IPropertyHost20>(Host)) View->SetWidth(Host20->GetDropDownWidth());
  View->OnNewAction = [this](TObject* Sender, const String& Category, TClass C, TContainedActionList* List) {
    CreateNewAction(Sender, Category, C, List);
  };
  View->OnSelectAction = [this](TObject* Sender, TContainedAction* Action) { SelectAction(Sender, Action); };
  View->SetDesigner(FDesigner);
  View->SetVisible(true);
  Host->DropDownControl(View);
}

void TActionProperty::SelectAction(TObject*, TContainedAction* Action) {
  if (FHost) FHost->CloseDropDown();
  if (!Action) return SetValue(String());
  SetValue((Action->Owner() ? Action->Owner()->Name() : String()) + "." + Action->Name());
}

void TActionProperty::CreateNewAction(TObject* Sender, const String& ACategory, TClass AActionClass,
                                      TContainedActionList* AActionList) {
  String Category = CompareText(ACategory, LoadResString(SActionCategoryNone)) == 0 ? String() : ACategory;
  String FrameworkType = GetFrameworkType();
  TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(GetIDEActions(FrameworkType));
  auto* Action = static_cast<TContainedAction*>(CreateAction(AActionList->Owner(), AActionClass, FrameworkType));
  auto FreeAction = OnFailure([&]() noexcept { Action->Destroy(); });
  String Name = GetNewActionName(Action, FrameworkType);
  if (FDesigner && AActionList->Owner() == FDesigner->GetRoot()) {
    Action->SetName(FDesigner->UniqueName(Name));
  } else {
    IPtr<IDesigner> Other = QueryAs<IDesigner>(FindRootDesigner(AActionList->Owner()));
    if (!Other) throw Exception(SUnableToFindComponent, AActionList->Owner() ? AActionList->Owner()->Name() : String());
    Action->SetName(Other->UniqueName(Name));
  }
  if (!Category.empty()) {
    Action->SetCategory(Category);
  } else if (Action->Category().empty() && EnumRegisteredActionsProc) {
    if (!FRegisteredActionsRead) {
      EnumRegisteredActions(
          [this](const String& C, TClass Class, void*) {
            FRegisteredActionList.push_back({C, Class});
          },
          nullptr, FrameworkType);
      FRegisteredActionsRead = true;
    }
    for (const TRegisteredAction& R : FRegisteredActionList)
      if (R.ActionClass == Action->ClassType()) {
        Action->SetCategory(R.Category);
        break;
      }
  }
  Action->SetActionList(AActionList);
  if (IDEActions) IDEActions->CopyImageIfAvailable(Action, AActionList);
  SelectAction(Sender, Action);
}

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

void RegisterKilnActionEditors() {
  RegisterPropertyEditor(TBasicAction::StaticClass()->TypeInfo(), nullptr, "", TActionProperty::StaticClass());
  static bool Joined = false;
  if (Joined) return;
  Joined = true;
  InitializeActionEditors();
  AddDesignCoreStep(TCoreStage::DefaultRegistrations, "KilnActions", &StartKilnActions, &StopKilnActions);
}

} // namespace formkit
