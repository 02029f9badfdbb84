//===- editors/ActionEditors.h - Registries of actions and their frameworks ===//
//
// Three things an action editor stands on. The registry of frameworks: each
// widget framework tells, through a `TIDEActions` class of its own, which
// classes are its action base, its default action and its action list. The
// registry of standard action classes, grouped by category, which the
// runtime's action registration calls reach through their hooks. And the
// making of a new action: from a registered class, filled from a prototype of
// its resource, and named by its class and category.
//
// Example:
//   RegisterActionsInFramework("Kiln", TKilnIDEActions::StaticClass());
//   RegActions("Edit", {TEditCopy::StaticClass()}, TStandardActions::StaticClass());
//   TBasicAction* A = CreateAction(Form, TEditCopy::StaticClass(), "Kiln");
//   String Name = GetNewActionName(A, "Kiln");   // "TEditCopy"; UniqueName gives "EditCopy1"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Actions.h"

#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// Texts
//===----------------------------------------------------------------------===//

FK_RESOURCESTRING(SInvalidString, "Invalid string");
FK_RESOURCESTRING(SParamIsNil, "Parameter %s cannot be nil");
FK_RESOURCESTRING(SFrameworkRegistered, "The %s framework is already registered");
FK_RESOURCESTRING(SActionMustInherit, "The created action, must inherit from %s");
FK_RESOURCESTRING(SActionCategoryNone, "(No Category)");
FK_RESOURCESTRING(SUnableToFindComponent, "Unable to locate form/component, '%s'");
FK_RESOURCESTRING(SCreateNewAction, "New Action");
FK_RESOURCESTRING(SCreateNewStdAction, "New Standard Action");
FK_RESOURCESTRING(SNoActionsImpl, "Actions not implemented for the current framework '%s'");
FK_RESOURCESTRING(SNoDefineBase, "Not defined for the base class of ActionList");
FK_RESOURCESTRING(SNoActionLists, "Instances of %s are not found in the current units");
FK_RESOURCESTRING(SCannotSetProperty, "You cannot set property...");
// Texts for hosts.
FK_RESOURCESTRING(StrEFnoReg, "The current framework is not registered or cannot be identified");
FK_RESOURCESTRING(StrNoSuported, "(standard actions are not registered)");
FK_RESOURCESTRING(StrFrameworkTypeNone, "framework is not supported");
FK_RESOURCESTRING(StrFrameworkTypeDef, "framework is default");
FK_RESOURCESTRING(SNewAction, "New %s");
FK_RESOURCESTRING(SNewActionHint, "New %s|Create new %s");

//===----------------------------------------------------------------------===//
// A framework's action classes
//===----------------------------------------------------------------------===//

/// What a widget framework tells of its actions. A framework derives a class and
/// registers the class; its operations are the class's, so the instance that carries
/// them (`IDEActionsOf`) holds no state. The base answers null and does nothing.
class FK_API TIDEActions : public TObject {
  FK_CLASS(TIDEActions, TObject)

  /// Copies what a new action takes from its prototype; the base copies the category
  /// when both are contained actions.
  virtual void AssignAction(TBasicAction* Source, TBasicAction* Dest);
  /// A link that tells `OnChange` of changes to an image list; owned by the caller.
  virtual TObjectGuard<TObject> CreateImageLink(const TNotifyEvent& OnChange);
  /// The images of `ActionList` as an image list; owned by the caller.
  virtual TObjectGuard<TObject> CreateImageList(TContainedActionList* ActionList);
  /// The class of a plain new action.
  virtual TClass DefaultActionClass() { return nullptr; }
  /// The class every action of the framework descends from.
  virtual TClass BaseActionClass() { return nullptr; }
  /// The class every action list of the framework descends from.
  virtual TClass BaseActionListClass() { return nullptr; }
  virtual void CopyImageIfAvailable(TContainedAction*, TContainedActionList*) {}
  virtual void RegisterImageLink(TContainedActionList*, TObject*) {}
  virtual void UnregisterImageLink(TContainedActionList*, TObject*) {}
};

/// A class of `TIDEActions`: the record of the class or of a descendant.
using TIDEActionsClass = TClass;

/// The carrier of the operations of `Class` for one call; null for a null class.
/// Costs one allocation.
[[nodiscard]] FK_API TObjectGuard<TIDEActions> IDEActionsOf(TIDEActionsClass Class);

//===----------------------------------------------------------------------===//
// The registry of frameworks
//===----------------------------------------------------------------------===//

/// One registered framework: its key (trimmed, upper case) and class.
struct TFrameworkActions {
  String Key;
  TIDEActionsClass IDEActions = nullptr;
};

/// The answer for an empty framework name; null at start and never set here.
FK_API extern TIDEActionsClass vOldIDEActions;

/// Registers `AIDEActions` for the framework named `AFrameworkType`. Raises
/// `EActionError` "Invalid string" for an empty name, "Parameter AIDEActions cannot be
/// nil", and "The %s framework is already registered" for another class under the name;
/// the same class again changes nothing.
FK_API void RegisterActionsInFramework(const String& AFrameworkType, TIDEActionsClass AIDEActions);
/// Drops the framework; nothing when it is absent.
FK_API void UnregisterActionsInFramework(const String& AFrameworkType);
/// The class of a framework: `vOldIDEActions` for an empty name, null for an unknown one.
[[nodiscard]] FK_API TIDEActionsClass GetIDEActions(const String& AFrameworkType);
/// The class of the framework whose action list class `AActionList` descends from (the
/// last match in key order), with its name in `FrameworkType`; with a null list or no
/// framework registered, the class of the current project's framework.
[[nodiscard]] FK_API TIDEActionsClass GetIDEActions(TContainedActionList* AActionList, String& FrameworkType);
/// Fills `List` with the registered frameworks in key order and returns their count;
/// raises `EActionError` "Parameter List cannot be nil" for null.
FK_API int GetIDEActionsList(std::vector<TFrameworkActions>* List);

/// Asks the host for the framework of the current project; empty when unknown. Null
/// until the host's tool services set it.
FK_API extern String (*GetFrameworkTypeProc)();
/// The framework of the current project, through `GetFrameworkTypeProc`.
[[nodiscard]] FK_API String GetFrameworkType();

//===----------------------------------------------------------------------===//
// The registry of standard actions
//===----------------------------------------------------------------------===//

/// One registered class; an unregistered entry keeps its slot with a null class.
struct TActionClassRec {
  TClass ActionClass = nullptr;
  /// The `CurrentGroup` at registration; -1 once unregistered.
  int Group = -1;
  /// The component class holding prototypes of the category's actions, or null.
  TClass Resource = nullptr;
};

/// A category and its classes in order of registration.
struct TActionCategoryRec {
  String Category;
  std::vector<TActionClassRec> Actions;
};

/// The categories in order of their first registration.
[[nodiscard]] FK_API const std::vector<TActionCategoryRec>& RegisteredActions();

/// Called after every change of the registry; set by the host, null until then.
using TNotifyActionListChange = void (*)();
FK_API extern TNotifyActionListChange NotifyActionListChange;

/// Registers the contained action classes among `ActionClasses` under `Category`
/// (joining a category of the same name in any case), each once, in `CurrentGroup`, and
/// drops the cached instance of `Resource`.
FK_API void RegActions(const String& Category, const std::vector<TClass>& ActionClasses, TClass Resource);
/// Unregisters the classes in every category and drops every cached resource.
FK_API void UnRegActions(const std::vector<TClass>& ActionClasses);
/// Calls `Proc` with each registered class of the framework (one that descends from its
/// base action class), category by category; a category left with no live class has its
/// entries cleared.
FK_API void EnumActions(const TEnumActionProc& Proc, void* Info, const String& FrameworkType);
/// Makes an action of `ActionClass` owned by `AOwner`, filled from the prototype in its
/// resource. Raises `EActionError` "The created action, must inherit from
/// TContainedAction" for another class.
[[nodiscard]] FK_API TBasicAction* CreateAction(TComponent* AOwner, TClass ActionClass, const String& FrameworkType);
/// A class-shaped name for a new action: its class name with the prefixes "T", the
/// framework and the category stripped, and "T" and the category (without blanks) in front.
[[nodiscard]] FK_API String GetNewActionName(TBasicAction* Action, const String& FrameworkType);
/// Gives `To` the caption, check, enabling, help context, hint, picture, short cut and
/// visibility of `From`: what a new action takes from its prototype.
FK_API void CopyActionProperties(TContainedAction* From, TContainedAction* To);

//===----------------------------------------------------------------------===//
// Resources
//===----------------------------------------------------------------------===//

/// One live instance per resource class, owned here.
class FK_API TActionResourceCache {
public:
  /// The process's cache, made on first use.
  static TActionResourceCache& Instance();
  /// Takes ownership of `Instance` for `ResourceClass`, freeing one held before.
  void Add(TClass ResourceClass, TComponent* Instance);
  /// The instance of `ResourceClass`, or null.
  [[nodiscard]] TComponent* GetInstance(TClass ResourceClass) const;
  /// Frees the instance of `ResourceClass`; nothing when absent.
  void Remove(TClass ResourceClass) noexcept;
  /// Frees every instance.
  void Clear() noexcept;

private:
  std::vector<std::pair<TClass, TComponent*>> FItems;
};

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

/// Joins `StartActionEditors` and `StopActionEditors` to the start and stop of the design
/// core, among its registries. Call before or after `StartDesignCore`; a repeat does nothing.
FK_API void InitializeActionEditors();
/// Clears the runtime's four action hooks and subscribes to group changes. The host
/// assigns the hooks afterwards (`InstallActionHooks` does it for it).
FK_API void StartActionEditors();
/// Points the runtime's hooks at `RegActions`, `UnRegActions`, `EnumActions`, `CreateAction`.
FK_API void InstallActionHooks();
/// Unsubscribes, clears the hooks, frees the cached resources, the framework list and the
/// registered actions.
FK_API void StopActionEditors() noexcept;

} // namespace formkit
