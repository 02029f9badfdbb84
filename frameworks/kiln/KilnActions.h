//===- frameworks/kiln/KilnActions.h - Actions and menus -----------------===//
//
// An action is a command with its caption, check mark and enabled state in
// one place: menu items linked to it show what it says and run it when
// clicked. `OnUpdate` lets the owner set the state just before it is shown;
// `TActionList::UpdateActions` asks every action of the list. Kiln's action
// and list are the framework's forms of the contained action and list. A popup menu is
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
#include "platform/Actions.h"

namespace formkit {

class TActionList;

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

/// A command that menu items and buttons share: the framework's action class.
class FK_API TAction : public TContainedAction {
  FK_CLASS(TAction, TContainedAction)

  /// The Kiln list the action belongs to; null outside one or in another framework's list.
  TActionList* ActionList() const noexcept;
  /// Joins `Value` (may be null) at its end.
  void SetActionList(TActionList* Value);
};

/// The actions of a window; it does not own them.
class FK_API TActionList : public TContainedActionList {
  FK_CLASS(TActionList, TContainedActionList)

  /// The action at `Index`; null for an action that is no Kiln action. Raises
  /// `EListError` when out of range.
  TAction* Actions(int Index) const;
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
  bool Visible() const noexcept { return FVisible; }
  void SetVisible(bool Value) noexcept { FVisible = Value; }
  /// The key that chooses the entry; 0 for none.
  int ShortCut() const noexcept { return FShortCut; }
  void SetShortCut(int Value) noexcept { FShortCut = Value; }
  /// The entry's picture in its menu's images; -1 for none.
  int ImageIndex() const noexcept { return FImageIndex; }
  void SetImageIndex(int Value) noexcept { FImageIndex = Value; }
  /// The entries of one group exclude each other when they are radio items.
  int GroupIndex() const noexcept { return FGroupIndex; }
  void SetGroupIndex(int Value) noexcept { FGroupIndex = Value; }
  bool RadioItem() const noexcept { return FRadioItem; }
  void SetRadioItem(bool Value) noexcept { FRadioItem = Value; }
  /// A separator line: its caption is "-".
  bool IsLine() const { return Caption() == "-"; }
  /// The linked action; not owned, and dropped when it goes.
  TAction* Action() const noexcept { return FAction; }
  void SetAction(TAction* Value);

  int Count() const noexcept { return static_cast<int>(FItems.size()); }
  /// Raises `EListError` when out of range.
  TMenuItem* Items(int Index) const;
  /// Puts `Item` last under this one, out of any other; it is not owned.
  void Add(TMenuItem* Item);
  /// Puts `Item` at `Index` (clamped) under this one, out of any other; not owned.
  void Insert(int Index, TMenuItem* Item);
  /// Takes sub-item `Index` out, without freeing it. Raises `EListError` when out of range.
  void Delete(int Index);
  /// The position of `Item` among the sub-items, or -1.
  int IndexOf(const TMenuItem* Item) const noexcept;
  TMenuItem* ParentItem() const noexcept { return FParent; }

  /// Runs the action, or `OnClick` without one.
  virtual void Click();
  TNotifyEvent OnClick;

  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  String FCaption;
  bool FChecked = false;
  bool FEnabled = true;
  bool FVisible = true;
  bool FRadioItem = false;
  int FShortCut = 0;
  int FImageIndex = -1;
  int FGroupIndex = 0;
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
