//===- editors/ActionEditors.cpp - Registries of actions and their frameworks ===//
#include "editors/ActionEditors.h"

#include "core/DesignCore.h"
#include "core/EditorGroups.h"

#include <algorithm>
#include <memory>

namespace formkit {

namespace {

/// The registered frameworks sorted by key; exists only while one is registered.
std::unique_ptr<std::vector<TFrameworkActions>> FrameworkActionsList;
std::vector<TActionCategoryRec> RegisteredActionsList;
TActionResourceCache* ResourceCache = nullptr;

String FrameworkKey(const String& Name) { return UpperCase(Trim(Name)); }

std::vector<TFrameworkActions>::iterator FindKey(const String& Key) {
  return std::lower_bound(FrameworkActionsList->begin(), FrameworkActionsList->end(), Key,
                          [](const TFrameworkActions& F, const String& K) { return F.Key < K; });
}

void NotifyChange() {
  if (NotifyActionListChange) NotifyActionListChange();
}

void Unregister(TActionClassRec& Entry) noexcept {
  Entry.ActionClass = nullptr;
  Entry.Group = -1;
}

void ActionGroupChanged(int Group) {
  for (TActionCategoryRec& Category : RegisteredActionsList)
    for (TActionClassRec& Entry : Category.Actions)
      if (Entry.ActionClass && Entry.Group == Group) Unregister(Entry);
  NotifyChange();
}

bool HasClass(const TActionCategoryRec& Category, TClass Class) {
  return std::any_of(Category.Actions.begin(), Category.Actions.end(),
                     [Class](const TActionClassRec& E) { return E.ActionClass == Class; });
}

/// The resource of the first entry of `Class`, over the categories in order.
TClass ResourceOf(TClass Class) {
  for (const TActionCategoryRec& Category : RegisteredActionsList)
    for (const TActionClassRec& Entry : Category.Actions)
      if (Entry.ActionClass == Class) return Entry.Resource;
  return nullptr;
}

/// The prototype of an action of `Class` in the resource instance: the first component
/// whose class name is that of `Class`.
TContainedAction* FindPrototype(TComponent* Resource, TClass Class) {
  if (Class->ClassName.empty()) return nullptr;
  for (int I = 0; I < Resource->ComponentCount(); ++I) {
    TComponent* C = Resource->Components(I);
    if (CompareText(C->ClassName(), Class->ClassName) != 0) continue;
    auto* Found = dynamic_cast<TContainedAction*>(C);
    if (!Found) throw EActionError(SActionMustInherit, TContainedAction::StaticClass()->ClassName);
    return Found;
  }
  return nullptr;
}


/// Strips prefix `P` (without its blanks) from `Name` when `Name` is more than two
/// characters longer and starts with it in any case.
void StripPrefix(String& Name, String P) {
  std::erase(P, ' ');
  if (Name.size() > P.size() + 2 && CompareText(std::string_view(Name).substr(0, P.size()), P) == 0)
    Name.erase(0, P.size());
}

} // namespace

//===----------------------------------------------------------------------===//
// TIDEActions
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TIDEActions, "ActionEditors") {}

void TIDEActions::AssignAction(TBasicAction* Source, TBasicAction* Dest) {
  auto* From = dynamic_cast<TContainedAction*>(Source);
  auto* To = dynamic_cast<TContainedAction*>(Dest);
  if (From && To) To->SetCategory(From->Category());
}

TObjectGuard<TObject> TIDEActions::CreateImageLink(const TNotifyEvent&) { return {}; }

TObjectGuard<TObject> TIDEActions::CreateImageList(TContainedActionList*) { return {}; }

TObjectGuard<TIDEActions> IDEActionsOf(TIDEActionsClass Class) {
  if (!Class) return {};
  if (!Class->InheritsFrom(TIDEActions::StaticClass()))
    throw EActionError(SActionMustInherit, TIDEActions::StaticClass()->ClassName);
  return TObjectGuard<TIDEActions>(static_cast<TIDEActions*>(Class->NewInstance()));
}

//===----------------------------------------------------------------------===//
// The registry of frameworks
//===----------------------------------------------------------------------===//

TIDEActionsClass vOldIDEActions = nullptr;
String (*GetFrameworkTypeProc)() = nullptr;

void RegisterActionsInFramework(const String& AFrameworkType, TIDEActionsClass AIDEActions) {
  String Key = FrameworkKey(AFrameworkType);
  if (Key.empty()) throw EActionError(SInvalidString);
  if (!AIDEActions) throw EActionError(SParamIsNil, "AIDEActions");
  if (!FrameworkActionsList) FrameworkActionsList = std::make_unique<std::vector<TFrameworkActions>>();
  auto At = FindKey(Key);
  if (At != FrameworkActionsList->end() && At->Key == Key) {
    if (At->IDEActions != AIDEActions) throw EActionError(SFrameworkRegistered, Key);
    return;
  }
  FrameworkActionsList->insert(At, TFrameworkActions{Key, AIDEActions});
}

void UnregisterActionsInFramework(const String& AFrameworkType) {
  if (!FrameworkActionsList) return;
  String Key = FrameworkKey(AFrameworkType);
  auto At = FindKey(Key);
  if (At != FrameworkActionsList->end() && At->Key == Key) FrameworkActionsList->erase(At);
  if (FrameworkActionsList->empty()) FrameworkActionsList.reset();
}

TIDEActionsClass GetIDEActions(const String& AFrameworkType) {
  TIDEActionsClass Result = vOldIDEActions;
  String Key = FrameworkKey(AFrameworkType);
  if (FrameworkActionsList && !Key.empty()) {
    auto At = FindKey(Key);
    Result = At != FrameworkActionsList->end() && At->Key == Key ? At->IDEActions : nullptr;
  }
  return Result;
}

TIDEActionsClass GetIDEActions(TContainedActionList* AActionList, String& FrameworkType) {
  if (!AActionList || !FrameworkActionsList) {
    FrameworkType = GetFrameworkType();
    return GetIDEActions(FrameworkType);
  }
  TIDEActionsClass Result = nullptr;
  for (const TFrameworkActions& F : *FrameworkActionsList) {
    TClass ListClass = IDEActionsOf(F.IDEActions)->BaseActionListClass();
    if (ListClass && AActionList->InheritsFrom(ListClass)) {
      FrameworkType = F.Key;
      Result = F.IDEActions;
    }
  }
  return Result;
}

int GetIDEActionsList(std::vector<TFrameworkActions>* List) {
  if (!List) throw EActionError(SParamIsNil, "List");
  List->clear();
  if (FrameworkActionsList) *List = *FrameworkActionsList;
  return static_cast<int>(List->size());
}

String GetFrameworkType() { return GetFrameworkTypeProc ? GetFrameworkTypeProc() : String(); }

//===----------------------------------------------------------------------===//
// The registry of standard actions
//===----------------------------------------------------------------------===//

TNotifyActionListChange NotifyActionListChange = nullptr;

const std::vector<TActionCategoryRec>& RegisteredActions() { return RegisteredActionsList; }

void RegActions(const String& Category, const std::vector<TClass>& ActionClasses, TClass Resource) {
  std::vector<TClass> Classes;
  for (TClass C : ActionClasses)
    if (C && C->InheritsFrom(TContainedAction::StaticClass())) Classes.push_back(C);
  if (Resource) TActionResourceCache::Instance().Remove(Resource);
  auto Found = std::find_if(RegisteredActionsList.begin(), RegisteredActionsList.end(),
                            [&](const TActionCategoryRec& R) { return CompareText(R.Category, Category) == 0; });
  if (Found == RegisteredActionsList.end()) {
    RegisteredActionsList.push_back(TActionCategoryRec{});
    Found = RegisteredActionsList.end() - 1;
  }
  std::erase_if(Classes, [&](TClass C) { return HasClass(*Found, C); });
  // Room first, so that a failing registration leaves the category as it was.
  Found->Actions.reserve(Found->Actions.size() + Classes.size());
  Found->Category = Category;
  for (TClass C : Classes) {
    RegisterNoIcon({C});
    RegisterClass(C);
    Found->Actions.push_back(TActionClassRec{C, CurrentGroup, Resource});
  }
  NotifyChange();
}

void UnRegActions(const std::vector<TClass>& ActionClasses) {
  TActionResourceCache::Instance().Clear();
  for (TClass C : ActionClasses)
    for (TActionCategoryRec& Category : RegisteredActionsList)
      for (TActionClassRec& Entry : Category.Actions)
        if (Entry.ActionClass == C) Unregister(Entry);
  NotifyChange();
}

void EnumActions(const TEnumActionProc& Proc, void* Info, const String& FrameworkType) {
  if (RegisteredActionsList.empty()) return;
  TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(GetIDEActions(FrameworkType));
  TClass Base = IDEActions ? IDEActions->BaseActionClass() : nullptr;
  if (!Base) return;
  for (TActionCategoryRec& Category : RegisteredActionsList) {
    bool Live = false;
    for (const TActionClassRec& Entry : Category.Actions) {
      if (!Entry.ActionClass) continue;
      Live = true;
      if (Entry.ActionClass->InheritsFrom(Base)) Proc(Category.Category, Entry.ActionClass, Info);
    }
    if (!Live) Category.Actions.clear();
  }
}

TBasicAction* CreateAction(TComponent* AOwner, TClass ActionClass, const String& FrameworkType) {
  if (!ActionClass || !ActionClass->InheritsFrom(TContainedAction::StaticClass()))
    throw EActionError(SActionMustInherit, TContainedAction::StaticClass()->ClassName);
  auto* Action = static_cast<TContainedAction*>(CreateComponent(ActionClass, AOwner));
  try {
    TClass Resource = ResourceOf(ActionClass);
    if (!Resource) return Action;
    TActionResourceCache& Cache = TActionResourceCache::Instance();
    TComponent* Instance = Cache.GetInstance(Resource);
    if (!Instance) {
      Instance = CreateComponent(Resource, nullptr);
      Cache.Add(Resource, Instance);
    }
    if (TContainedAction* Prototype = FindPrototype(Instance, ActionClass)) {
      if (TObjectGuard<TIDEActions> IDEActions = IDEActionsOf(GetIDEActions(FrameworkType)))
        IDEActions->AssignAction(Prototype, Action);
      else
        CopyActionProperties(Prototype, Action);
    }
    return Action;
  } catch (...) {
    Action->Destroy();
    throw;
  }
}

void CopyActionProperties(TContainedAction* From, TContainedAction* To) {
  To->SetCaption(From->Caption());
  To->SetChecked(From->Checked());
  To->SetEnabled(From->Enabled());
  To->SetHelpContext(From->HelpContext());
  To->SetHint(From->Hint());
  To->SetImageIndex(From->ImageIndex());
  To->SetShortCut(From->ShortCut());
  To->SetVisible(From->Visible());
}

String GetNewActionName(TBasicAction* Action, const String& FrameworkType) {
  String Name = Action->ClassName();
  if (auto* Contained = dynamic_cast<TContainedAction*>(Action)) {
    String Category = Contained->Category();
    std::erase(Category, ' ');
    StripPrefix(Name, "t");
    StripPrefix(Name, FrameworkType);
    StripPrefix(Name, Category);
    Name = "T" + Category + Name;
  }
  return Name;
}

//===----------------------------------------------------------------------===//
// Resources
//===----------------------------------------------------------------------===//

TActionResourceCache& TActionResourceCache::Instance() {
  if (!ResourceCache) ResourceCache = new TActionResourceCache;
  return *ResourceCache;
}

void TActionResourceCache::Add(TClass ResourceClass, TComponent* Instance) {
  FItems.reserve(FItems.size() + 1);
  Remove(ResourceClass);
  FItems.emplace_back(ResourceClass, Instance);
}

TComponent* TActionResourceCache::GetInstance(TClass ResourceClass) const {
  for (const auto& [Class, Instance] : FItems)
    if (Class == ResourceClass) return Instance;
  return nullptr;
}

void TActionResourceCache::Remove(TClass ResourceClass) noexcept {
  auto At = std::find_if(FItems.begin(), FItems.end(), [&](const auto& I) { return I.first == ResourceClass; });
  if (At == FItems.end()) return;
  TComponent* Instance = At->second;
  FItems.erase(At);
  Instance->Destroy();
}

void TActionResourceCache::Clear() noexcept {
  while (!FItems.empty()) Remove(FItems.back().first);
}

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

void InitializeActionEditors() {
  static bool Joined = false;
  if (Joined) return;
  Joined = true;
  AddDesignCoreStep(TCoreStage::Registries, "ActionEditors", &StartActionEditors, &StopActionEditors);
}

void StartActionEditors() {
  RegisterActionsProc = nullptr;
  UnRegisterActionsProc = nullptr;
  EnumRegisteredActionsProc = nullptr;
  CreateActionProc = nullptr;
  NotifyGroupChange(&ActionGroupChanged);
}

void InstallActionHooks() {
  RegisterActionsProc = &RegActions;
  UnRegisterActionsProc = &UnRegActions;
  EnumRegisteredActionsProc = &EnumActions;
  CreateActionProc = &CreateAction;
}

void StopActionEditors() noexcept {
  UnnotifyGroupChange(&ActionGroupChanged);
  RegisterActionsProc = nullptr;
  UnRegisterActionsProc = nullptr;
  EnumRegisteredActionsProc = nullptr;
  CreateActionProc = nullptr;
  if (ResourceCache) {
    ResourceCache->Clear();
    delete ResourceCache;
    ResourceCache = nullptr;
  }
  FrameworkActionsList.reset();
  RegisteredActionsList.clear();
}

} // namespace formkit
