//===- platform/Actions.cpp - Actions and action lists of any framework --===//
#include "platform/Actions.h"

#include <algorithm>

namespace formkit {

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBasicAction, "Actions") {
  B.Event("OnExecute", &TBasicAction::OnExecute);
  B.Event("OnUpdate", &TBasicAction::OnUpdate);
}

bool TBasicAction::Execute() {
  if (!OnExecute) return false;
  OnExecute(this);
  return true;
}

bool TBasicAction::Update() {
  if (!OnUpdate) return false;
  OnUpdate(this);
  return true;
}

FK_IMPLEMENT(TContainedAction, "Actions") {
  B.Property("Caption", &TContainedAction::Caption, &TContainedAction::SetCaption);
  B.Property("Category", &TContainedAction::Category, &TContainedAction::SetCategory);
  B.Property("Checked", &TContainedAction::Checked, &TContainedAction::SetChecked).Default(false);
  B.Property("Enabled", &TContainedAction::Enabled, &TContainedAction::SetEnabled).Default(true);
  B.Property("HelpContext", &TContainedAction::HelpContext, &TContainedAction::SetHelpContext).Default(0);
  B.Property("Hint", &TContainedAction::Hint, &TContainedAction::SetHint);
  B.Property("ImageIndex", &TContainedAction::ImageIndex, &TContainedAction::SetImageIndex).Default(-1);
  B.Property("ShortCut", &TContainedAction::ShortCut, &TContainedAction::SetShortCut).Default(0);
  B.Property("Visible", &TContainedAction::Visible, &TContainedAction::SetVisible).Default(true);
}

void TContainedAction::BeforeDestruction() {
  SetActionList(nullptr);
  inherited::BeforeDestruction();
}

bool TContainedAction::Execute() { return FEnabled && inherited::Execute(); }

void TContainedAction::SetActionList(TContainedActionList* Value) {
  if (Value == FActionList) return;
  if (Value) Value->FActions.reserve(Value->FActions.size() + 1);
  if (FActionList) std::erase(FActionList->FActions, this);
  FActionList = Value;
  if (Value) Value->FActions.push_back(this);
}

int TContainedAction::Index() const noexcept {
  if (!FActionList) return -1;
  auto& All = FActionList->FActions;
  return static_cast<int>(std::find(All.begin(), All.end(), this) - All.begin());
}

//===----------------------------------------------------------------------===//
// Action lists
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TContainedActionList, "Actions") {}

void TContainedActionList::BeforeDestruction() {
  for (TContainedAction* A : FActions) A->FActionList = nullptr;
  FActions.clear();
  inherited::BeforeDestruction();
}

TContainedAction* TContainedActionList::Actions(int Index) const {
  if (Index < 0 || Index >= ActionCount()) throw EListError(SContainedActionIndexError, Index);
  return FActions[static_cast<std::size_t>(Index)];
}

void TContainedActionList::UpdateActions() {
  // A copy: an update may add or remove actions.
  std::vector<TContainedAction*> Now = FActions;
  for (TContainedAction* A : Now) A->Update();
}

std::vector<TContainedAction*> TContainedActionList::ActionsOfCategory(const String& Category) const {
  std::vector<TContainedAction*> Result;
  for (TContainedAction* A : FActions)
    if (CompareText(A->Category(), Category) == 0) Result.push_back(A);
  return Result;
}

//===----------------------------------------------------------------------===//
// The hooks of the registry of standard actions
//===----------------------------------------------------------------------===//

std::function<void(const String&, const std::vector<TClass>&, TClass)> RegisterActionsProc;
std::function<void(const std::vector<TClass>&)> UnRegisterActionsProc;
std::function<void(const TEnumActionProc&, void*, const String&)> EnumRegisteredActionsProc;
std::function<TBasicAction*(TComponent*, TClass, const String&)> CreateActionProc;

void RegisterActions(const String& Category, const std::vector<TClass>& ActionClasses, TClass Resource) {
  if (!RegisterActionsProc) throw EActionError(SActionRegistrationMissing);
  RegisterActionsProc(Category, ActionClasses, Resource);
}

void UnRegisterActions(const std::vector<TClass>& ActionClasses) {
  if (!UnRegisterActionsProc) throw EActionError(SActionRegistrationMissing);
  UnRegisterActionsProc(ActionClasses);
}

void EnumRegisteredActions(const TEnumActionProc& Proc, void* Info, const String& FrameworkType) {
  if (EnumRegisteredActionsProc) EnumRegisteredActionsProc(Proc, Info, FrameworkType);
}

TBasicAction* CreateRegisteredAction(TComponent* Owner, TClass ActionClass, const String& FrameworkType) {
  if (!CreateActionProc) throw EActionError(SActionRegistrationMissing);
  return CreateActionProc(Owner, ActionClass, FrameworkType);
}

} // namespace formkit
