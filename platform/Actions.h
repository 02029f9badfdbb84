//===- platform/Actions.h - Actions and action lists of any framework ----===//
//
// An action is a component that names a command once (caption, hint, check
// mark, enabled state, shortcut, category) so that the controls of a window
// can share it. `TBasicAction` runs the command; `TContainedAction` is an
// action that lives in a `TContainedActionList`. Each widget framework derives
// its own action and list classes from these two.
//
// The design environment keeps the registry of a framework's standard action
// classes. The runtime reaches it only through four hooks that the environment
// sets; without them registration raises and enumeration finds nothing.
//
// Example:
//   RegisterActions("Edit", {TEditCopy::StaticClass()}, nullptr);   // through the hook
//   TBasicAction* A = CreateRegisteredAction(Form, TEditCopy::StaticClass(), "Kiln");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

#include <functional>
#include <vector>

namespace formkit {

class TContainedActionList;

/// Raised by the action registries and by actions for a request they cannot serve.
FK_EXCEPTION(EActionError, Exception);

FK_RESOURCESTRING(SActionRegistrationMissing, "No action registry is installed");
FK_RESOURCESTRING(SContainedActionIndexError, "Action index out of bounds (%d)");

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

/// A command that controls share: `Execute` runs `OnExecute`, `Update` runs `OnUpdate`.
class FK_API TBasicAction : public TComponent {
  FK_CLASS(TBasicAction, TComponent)

  /// Runs `OnExecute` when there is one; true when it ran.
  virtual bool Execute();
  /// Runs `OnUpdate`; true when there is one.
  virtual bool Update();

  TNotifyEvent OnExecute;
  TNotifyEvent OnUpdate;
};

/// An action that belongs to an action list and carries what controls show of it.
class FK_API TContainedAction : public TBasicAction {
  FK_CLASS(TContainedAction, TBasicAction)
  void BeforeDestruction() override;

  const String& Caption() const noexcept { return FCaption; }
  void SetCaption(const String& Value) { FCaption = Value; }
  /// The group the action is listed under in editors; empty for none.
  const String& Category() const noexcept { return FCategory; }
  void SetCategory(const String& Value) { FCategory = Value; }
  bool Checked() const noexcept { return FChecked; }
  void SetChecked(bool Value) noexcept { FChecked = Value; }
  bool Enabled() const noexcept { return FEnabled; }
  void SetEnabled(bool Value) noexcept { FEnabled = Value; }
  int HelpContext() const noexcept { return FHelpContext; }
  void SetHelpContext(int Value) noexcept { FHelpContext = Value; }
  const String& Hint() const noexcept { return FHint; }
  void SetHint(const String& Value) { FHint = Value; }
  /// The index of the action's picture in its list's images; -1 for none.
  int ImageIndex() const noexcept { return FImageIndex; }
  void SetImageIndex(int Value) noexcept { FImageIndex = Value; }
  /// The key combination that runs the action: a virtual key in the low byte and the
  /// shift keys above it; 0 for none.
  int ShortCut() const noexcept { return FShortCut; }
  void SetShortCut(int Value) noexcept { FShortCut = Value; }
  /// Whether controls of the action show; a hidden action still runs.
  bool Visible() const noexcept { return FVisible; }
  void SetVisible(bool Value) noexcept { FVisible = Value; }

  /// Runs `OnExecute` when the action is enabled and has one; true when it ran.
  bool Execute() override;

  /// The list the action belongs to; not owned.
  TContainedActionList* ActionList() const noexcept { return FActionList; }
  /// Leaves the old list and joins `Value` (may be null) at its end.
  void SetActionList(TContainedActionList* Value);
  /// The position in the list; -1 outside one.
  int Index() const noexcept;

private:
  friend class TContainedActionList;
  String FCaption;
  String FCategory;
  bool FChecked = false;
  bool FEnabled = true;
  int FHelpContext = 0;
  String FHint;
  int FImageIndex = -1;
  int FShortCut = 0;
  bool FVisible = true;
  TContainedActionList* FActionList = nullptr;
};

//===----------------------------------------------------------------------===//
// Action lists
//===----------------------------------------------------------------------===//

/// The actions of a window, in order; it does not own them (their owner does).
class FK_API TContainedActionList : public TComponent {
  FK_CLASS(TContainedActionList, TComponent)
  void BeforeDestruction() override;

  int ActionCount() const noexcept { return static_cast<int>(FActions.size()); }
  /// Raises `EListError` "Action index out of bounds (%d)" when out of range.
  TContainedAction* Actions(int Index) const;
  /// Updates every action, in order.
  void UpdateActions();
  /// The actions of `Category` (by `CompareText`), in list order.
  [[nodiscard]] std::vector<TContainedAction*> ActionsOfCategory(const String& Category) const;

private:
  friend class TContainedAction;
  std::vector<TContainedAction*> FActions;
};

//===----------------------------------------------------------------------===//
// The hooks of the registry of standard actions
//===----------------------------------------------------------------------===//

/// Told each registered class with its category and `Info`.
using TEnumActionProc = std::function<void(const String& Category, TClass ActionClass, void* Info)>;

/// Set by the design environment; null until then.
FK_API extern std::function<void(const String& Category, const std::vector<TClass>& ActionClasses, TClass Resource)>
    RegisterActionsProc;
FK_API extern std::function<void(const std::vector<TClass>& ActionClasses)> UnRegisterActionsProc;
FK_API extern std::function<void(const TEnumActionProc& Proc, void* Info, const String& FrameworkType)>
    EnumRegisteredActionsProc;
FK_API extern std::function<TBasicAction*(TComponent* Owner, TClass ActionClass, const String& FrameworkType)>
    CreateActionProc;

/// Registers standard action classes under `Category`, with `Resource` (a component
/// class holding prototype actions, or null). Raises `EActionError` "No action registry
/// is installed" without the hook.
FK_API void RegisterActions(const String& Category, const std::vector<TClass>& ActionClasses, TClass Resource);
/// Unregisters the classes; raises like `RegisterActions` without the hook.
FK_API void UnRegisterActions(const std::vector<TClass>& ActionClasses);
/// Enumerates the registered classes of a framework; nothing without the hook.
FK_API void EnumRegisteredActions(const TEnumActionProc& Proc, void* Info, const String& FrameworkType);
/// Creates an action of a registered class, filled from its prototype; raises like
/// `RegisterActions` without the hook.
[[nodiscard]] FK_API TBasicAction* CreateRegisteredAction(TComponent* Owner, TClass ActionClass,
                                                          const String& FrameworkType);

} // namespace formkit
