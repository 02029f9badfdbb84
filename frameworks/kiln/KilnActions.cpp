//===- frameworks/kiln/KilnActions.cpp - Actions and menus ---------------===//
#include "frameworks/kiln/KilnActions.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SMenuIndexError, "Menu index out of bounds (%d)");
FK_RESOURCESTRING(SMenuItemLoop, "A menu item cannot hold itself or an item above it");

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TAction, "KilnActions") {}

TActionList* TAction::ActionList() const noexcept {
  return dynamic_cast<TActionList*>(TContainedAction::ActionList());
}

void TAction::SetActionList(TActionList* Value) { TContainedAction::SetActionList(Value); }

FK_IMPLEMENT(TActionList, "KilnActions") {}

TAction* TActionList::Actions(int Index) const { return dynamic_cast<TAction*>(TContainedActionList::Actions(Index)); }

//===----------------------------------------------------------------------===//
// Menus
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMenuItem, "KilnMenus") {
  B.Property("Checked", &TMenuItem::Checked, &TMenuItem::SetChecked).Default(false);
  B.Property("GroupIndex", &TMenuItem::GroupIndex, &TMenuItem::SetGroupIndex).Default(0);
  B.Property("ImageIndex", &TMenuItem::ImageIndex, &TMenuItem::SetImageIndex).Default(-1);
  B.Property("RadioItem", &TMenuItem::RadioItem, &TMenuItem::SetRadioItem).Default(false);
  B.Property("ShortCut", &TMenuItem::ShortCut, &TMenuItem::SetShortCut).Default(0);
  B.Property("Visible", &TMenuItem::Visible, &TMenuItem::SetVisible).Default(true);
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

void TMenuItem::Add(TMenuItem* Item) { Insert(Count(), Item); }

void TMenuItem::Insert(int Index, TMenuItem* Item) {
  for (const TMenuItem* Up = this; Up; Up = Up->FParent)
    if (Up == Item) throw EInvalidOperation(SMenuItemLoop);
  FItems.reserve(FItems.size() + 1);
  if (Item->FParent) std::erase(Item->FParent->FItems, Item);
  Item->FParent = this;
  Index = std::clamp(Index, 0, Count());
  FItems.insert(FItems.begin() + Index, Item);
}

void TMenuItem::Delete(int Index) {
  TMenuItem* Item = Items(Index);
  FItems.erase(FItems.begin() + Index);
  Item->FParent = nullptr;
}

int TMenuItem::IndexOf(const TMenuItem* Item) const noexcept {
  auto Found = std::find(FItems.begin(), FItems.end(), Item);
  return Found == FItems.end() ? -1 : static_cast<int>(Found - FItems.begin());
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
