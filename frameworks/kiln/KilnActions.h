//===- frameworks/kiln/KilnActions.h - Actions and menus -----------------===//
//
// An action is a command with its caption, check mark and enabled state in
// one place: menu items linked to it show what it says and run it when
// clicked. `OnUpdate` lets the owner set the state just before it is shown;
// `TActionList::UpdateActions` asks every action of the list. A popup menu is
// a tree of menu items under its `Items`.
//
// Example:
//   auto* Cmd = CreateComponentOf<TAction>(Form);
//   Cmd->SetCaption("&Toolbar");
//   Cmd->OnExecute = TNotifyEvent::Bind<&TMyForm::ToolbarExecute>(Form);
//   auto* Item = CreateComponentOf<TMenuItem>(Form);
//   Item->SetAction(Cmd);
//   Popup->Items()->Add(Item);
//   Item->Click();   // runs ToolbarExecute
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

class TActionList;

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

/// A command that menu items and buttons share.
class FK_API TAction : public TComponent {
  FK_CLASS(TAction, TComponent)
  void BeforeDestruction() override;

  const String& Caption() const noexcept { return FCaption; }
  void SetCaption(const String& Value) { FCaption = Value; }
  const String& Hint() const noexcept { return FHint; }
  void SetHint(const String& Value) { FHint = Value; }
  bool Checked() const noexcept { return FChecked; }
  void SetChecked(bool Value) noexcept { FChecked = Value; }
  bool Enabled() const noexcept { return FEnabled; }
  void SetEnabled(bool Value) noexcept { FEnabled = Value; }
  /// Whether menu items and buttons of the action show; a hidden action still runs.
  bool Visible() const noexcept { return FVisible; }
  void SetVisible(bool Value) noexcept { FVisible = Value; }
  /// The list the action belongs to; not owned.
  TActionList* ActionList() const noexcept { return FActionList; }
  void SetActionList(TActionList* Value);

  /// Runs `OnExecute` when the action is enabled and has one; true when it ran.
  bool Execute();
  /// Runs `OnUpdate`; true when there is one.
  bool Update();

  TNotifyEvent OnExecute;
  TNotifyEvent OnUpdate;

private:
  friend class TActionList;
  String FCaption;
  String FHint;
  bool FChecked = false;
  bool FEnabled = true;
  bool FVisible = true;
  TActionList* FActionList = nullptr;
};

/// The actions of a window; it does not own them.
class FK_API TActionList : public TComponent {
  FK_CLASS(TActionList, TComponent)
  void BeforeDestruction() override;

  int ActionCount() const noexcept { return static_cast<int>(FActions.size()); }
  /// Raises `EListError` when out of range.
  TAction* Actions(int Index) const;
  /// Updates every action, in order.
  void UpdateActions();

private:
  friend class TAction;
  std::vector<TAction*> FActions;
};

//===----------------------------------------------------------------------===//
// Menus
//===----------------------------------------------------------------------===//

/// One entry of a menu, and the entries under it. Linked to an action, it shows the
/// action's caption and check mark and runs it when clicked.
class FK_API TMenuItem : public TComponent {
  FK_CLASS(TMenuItem, TComponent)
  void BeforeDestruction() override;

  String Caption() const { return FAction ? FAction->Caption() : FCaption; }
  void SetCaption(const String& Value) { FCaption = Value; }
  bool Checked() const noexcept { return FAction ? FAction->Checked() : FChecked; }
  void SetChecked(bool Value) noexcept { FChecked = Value; }
  /// Whether the entry can be chosen; not tied to the action.
  bool Enabled() const noexcept { return FEnabled; }
  void SetEnabled(bool Value) noexcept { FEnabled = Value; }
  /// The linked action; not owned, and dropped when it goes.
  TAction* Action() const noexcept { return FAction; }
  void SetAction(TAction* Value);

  int Count() const noexcept { return static_cast<int>(FItems.size()); }
  /// Raises `EListError` when out of range.
  TMenuItem* Items(int Index) const;
  /// Puts `Item` last under this one, out of any other; it is not owned.
  void Add(TMenuItem* Item);
  TMenuItem* ParentItem() const noexcept { return FParent; }

  /// Runs the action, or `OnClick` without one.
  void Click();
  TNotifyEvent OnClick;

  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  String FCaption;
  bool FChecked = false;
  bool FEnabled = true;
  TAction* FAction = nullptr;
  TMenuItem* FParent = nullptr;
  std::vector<TMenuItem*> FItems;
};

/// A menu that pops up over a control; its entries hang under `Items`, which it owns.
class FK_API TPopupMenu : public TComponent {
  FK_CLASS(TPopupMenu, TComponent)
  void Create(TComponent* AOwner) override;
  TMenuItem* Items() const noexcept { return FItems; }
  /// Pops the menu up at the screen point (`X`, `Y`): here the point is recorded and
  /// the count of popups grows.
  void Popup(int X, int Y);
  TPoint PopupPoint() const noexcept { return FPopupPoint; }
  int PopupCount() const noexcept { return FPopupCount; }

private:
  TMenuItem* FItems = nullptr;
  TPoint FPopupPoint;
  int FPopupCount = 0;
};

} // namespace formkit
