//===- frameworks/kiln/KilnActions.cpp - Actions and menus ---------------===//
#include "frameworks/kiln/KilnActions.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SActionIndexError, "Action index out of bounds (%d)");
FK_RESOURCESTRING(SMenuIndexError, "Menu index out of bounds (%d)");
FK_RESOURCESTRING(SMenuItemLoop, "A menu item cannot hold itself or an item above it");

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TAction, "KilnActions") {
  B.Property("Caption", &TAction::Caption, &TAction::SetCaption);
  B.Property("Checked", &TAction::Checked, &TAction::SetChecked).Default(false);
  B.Property("Enabled", &TAction::Enabled, &TAction::SetEnabled).Default(true);
  B.Property("Hint", &TAction::Hint, &TAction::SetHint);
  B.Event("OnExecute", &TAction::OnExecute);
  B.Event("OnUpdate", &TAction::OnUpdate);
}

void TAction::BeforeDestruction() {
  SetActionList(nullptr);
  inherited::BeforeDestruction();
}

void TAction::SetActionList(TActionList* Value) {
  if (Value == FActionList) return;
  if (Value) Value->FActions.reserve(Value->FActions.size() + 1);
  if (FActionList) std::erase(FActionList->FActions, this);
  FActionList = Value;
  if (Value) Value->FActions.push_back(this);
}

bool TAction::Execute() {
  if (!FEnabled || !OnExecute) return false;
  OnExecute(this);
  return true;
}

bool TAction::Update() {
  if (!OnUpdate) return false;
  OnUpdate(this);
  return true;
}

FK_IMPLEMENT(TActionList, "KilnActions") {}

void TActionList::BeforeDestruction() {
  for (TAction* A : FActions) A->FActionList = nullptr;
  FActions.clear();
  inherited::BeforeDestruction();
}

TAction* TActionList::Actions(int Index) const {
  if (Index < 0 || Index >= ActionCount()) throw EListError(SActionIndexError, Index);
  return FActions[static_cast<std::size_t>(Index)];
}

void TActionList::UpdateActions() {
  // A copy: an update may add or remove actions.
  std::vector<TAction*> Now = FActions;
  for (TAction* A : Now) A->Update();
}

//===----------------------------------------------------------------------===//
// Menus
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMenuItem, "KilnMenus") {
  B.Property("Checked", &TMenuItem::Checked, &TMenuItem::SetChecked).Default(false);
  B.Event("OnClick", &TMenuItem::OnClick);
}

void TMenuItem::BeforeDestruction() {
  SetAction(nullptr);
  if (FParent) std::erase(FParent->FItems, this);
  for (TMenuItem* Item : FItems) Item->FParent = nullptr;
  FItems.clear();
  inherited::BeforeDestruction();
}

void TMenuItem::SetAction(TAction* Value) {
  if (Value == FAction) return;
  if (FAction) RemoveFreeNotification(FAction);
  FAction = Value;
  if (Value) FreeNotification(Value);
}

TMenuItem* TMenuItem::Items(int Index) const {
  if (Index < 0 || Index >= Count()) throw EListError(SMenuIndexError, Index);
  return FItems[static_cast<std::size_t>(Index)];
}

void TMenuItem::Add(TMenuItem* Item) {
  for (const TMenuItem* Up = this; Up; Up = Up->FParent)
    if (Up == Item) throw EInvalidOperation(SMenuItemLoop);
  FItems.reserve(FItems.size() + 1);
  if (Item->FParent) std::erase(Item->FParent->FItems, Item);
  Item->FParent = this;
  FItems.push_back(Item);
}

void TMenuItem::Click() {
  if (FAction) (void)FAction->Execute();
  else if (OnClick) OnClick(this);
}

void TMenuItem::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FAction) FAction = nullptr;
}

FK_IMPLEMENT(TPopupMenu, "KilnMenus") {}

void TPopupMenu::Popup(int X, int Y) {
  FPopupPoint = Point(X, Y);
  ++FPopupCount;
}

void TPopupMenu::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FItems = CreateComponentOf<TMenuItem>(this);
}

} // namespace formkit
