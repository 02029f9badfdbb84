//===- frameworks/kiln/design/KilnActionEditors.h - Kiln's actions on design ===//
//
// What the Kiln design package tells the action registries: the framework
// "Kiln" with its action, default action and action list classes, its
// standard actions under the category "Edit" with their prototypes, the
// runtime's action hooks pointed at the registries, and the framework of the
// current project as the host's module services give it. And the inspector's
// editor of `Action` properties: a drop-down list of the module's actions,
// with "New Action" and "New Standard Action" above them, each creating an
// action in the module's action list and choosing it.
//
// Example:
//   RegisterKilnActionEditors();   // in the design package's registration
//   TBasicAction* A = CreateRegisteredAction(Form, TEditCopy::StaticClass(), "Kiln");
//   A->ClassName();                // "TEditCopy", captioned "&Copy" from its prototype
//   ActionProp->Edit(Host, false); // drops the list down in the host's inspector
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ActionEditors.h"
#include "editors/ReferenceEditors.h"
#include "frameworks/kiln/KilnStdActns.h"

#include <functional>

namespace formkit {

/// The framework's name in the registry of frameworks.
inline constexpr const char* KilnFrameworkType = "Kiln";

/// Kiln's action classes: `TAction` is the base and the default, `TActionList` the list.
class FK_API TKilnIDEActions : public TIDEActions {
  FK_CLASS(TKilnIDEActions, TIDEActions)
  /// Copies the category and everything a control shows of the action.
  void AssignAction(TBasicAction* Source, TBasicAction* Dest) override;
  TClass DefaultActionClass() override { return TAction::StaticClass(); }
  TClass BaseActionClass() override { return TAction::StaticClass(); }
  TClass BaseActionListClass() override { return TActionList::StaticClass(); }
};

/// The framework of the current project by the host's module services: the one project
/// of the main project group; else the active project of the first open project group;
/// else the one open project (none when there are several). Empty without a project.
[[nodiscard]] FK_API String ProjectFrameworkType();

//===----------------------------------------------------------------------===//
// The drop-down list of actions
//===----------------------------------------------------------------------===//

/// Told to create an action of `AActionClass` in `AActionList`, under `ACategory`.
using TNewActionEvent = std::function<void(TObject* Sender, const String& ACategory, TClass AActionClass,
                                           TContainedActionList* AActionList)>;
/// Told the action chosen, or null for none.
using TSelectActionEvent = std::function<void(TObject* Sender, TContainedAction* Action)>;

/// The list an `Action` property drops down: row 0 "New Action", row 1 "New Standard
/// Action", row 2 a separator when actions follow, then the module's actions sorted by
/// name. "New Action" creates an action of the framework's default class at once when the
/// module has one action list; otherwise its menu names the lists. "New Standard
/// Action" opens a menu of lists, categories and classes.
class FK_API TActionListView : public TCustomControl {
  FK_CLASS(TActionListView, TCustomControl)
  void Create(TComponent* AOwner) override;

  /// Takes the actions and action lists of `Designer`'s module; nothing when it is the
  /// one held. Raises `Exception` "The created action, must inherit from %s" for a
  /// component of the framework's action class that is no action.
  void SetDesigner(const IPtr<IDesigner>& Designer);
  /// Fills both menus from the registered standard actions and the module's lists, or
  /// sets the message that says why there is nothing to create.
  void RebuildPopupMenus();
  /// Fills the rows and sizes the view to them.
  void RebuildListView();

  int RowCount() const noexcept { return static_cast<int>(FRows.size()); }
  const String& RowCaption(int Row) const { return FRows.at(static_cast<std::size_t>(Row)).Caption; }
  /// The action of a row from 3 on; null for the others.
  TContainedAction* RowAction(int Row) const { return FRows.at(static_cast<std::size_t>(Row)).Action; }
  /// Why nothing can be created here; empty when something can.
  const String& Msg() const noexcept { return FMsg; }
  /// The only action list of the module, or null.
  TContainedActionList* ActionList() const noexcept { return FActionList; }
  TPopupMenu* NewActionMenu() const noexcept { return FNewActnPopupMenu; }
  TPopupMenu* NewStdActionMenu() const noexcept { return FNewStdActnPopupMenu; }

  /// A click on `Row`; -1 for a click below the last row.
  void ClickRow(int Row);
  /// Enter acts on the selected row as a click when `OnSelectAction` is set; Right shows
  /// the menu of the selected row. Other keys do nothing here.
  void KeyDown(int Key);
  int SelectedRow() const noexcept { return FSelected; }
  void SetSelectedRow(int Row) noexcept { FSelected = Row; }

  TNewActionEvent OnNewAction;
  TSelectActionEvent OnSelectAction;

private:
  struct TRow {
    String Caption;
    TContainedAction* Action = nullptr;
  };
  /// What a menu item stands for: the list it creates in and the class it creates.
  struct TItemTag {
    TMenuItem* Item = nullptr;
    TContainedActionList* List = nullptr;
    TClass ActionClass = nullptr;
  };
  void ShowPopupMenu(int Row, TPopupMenu* Menu);
  void DoShowMsg();
  void DoShowMsgClick(TObject* Sender);
  void DoNewActionClick(TObject* Sender);
  void DoNewStdActionClick(TObject* Sender);
  /// A menu item owned by the view under `Parent`, standing for `List` and `ActionClass`.
  TMenuItem* AddItem(TMenuItem* Parent, const String& Caption, TContainedActionList* List, TClass ActionClass,
                     TNotifyEvent OnClick = {});
  const TItemTag* TagOf(TObject* Item) const;
  [[nodiscard]] std::vector<TContainedActionList*> FindActionLists() const;
  String ListCaption(TContainedActionList* List, bool Several) const;

  TContainedActionList* FActionList = nullptr;
  IPtr<IDesigner> FDesigner;
  TPopupMenu* FNewActnPopupMenu = nullptr;
  TPopupMenu* FNewStdActnPopupMenu = nullptr;
  /// Category name to the classes of that category, in registration order.
  std::vector<std::pair<String, std::vector<TClass>>> FStdActionList;
  TIDEActionsClass FIDEActions = nullptr;
  String FFrameworkType;
  String FMsg;
  std::vector<TRow> FRows;
  std::vector<TItemTag> FTags;
  std::vector<TContainedAction*> FActions;
  int FSelected = -1;
};

//===----------------------------------------------------------------------===//
// The editor of Action properties
//===----------------------------------------------------------------------===//

/// The editor of properties that hold an action: a drop-down of the module's actions
/// and the creation of new ones.
class FK_API TActionProperty : public TComponentProperty, public IProperty80 {
  FK_CLASS(TActionProperty, TComponentProperty)
  FK_INTERFACES(IProperty80)
  void BeforeDestruction() override;

  /// The inherited attributes without a value list, with a custom drop-down and
  /// volatile sub-properties.
  TPropertyAttributes GetAttributes() override;
  using TComponentProperty::Edit;
  /// Drops a new list view down in `Host`.
  void Edit(const IPtr<IPropertyHost>& Host, bool DblClick) override;
  /// Closes the drop-down and stores `Action` ("Owner.Name"), or clears for null.
  void SelectAction(TObject* Sender, TContainedAction* Action);
  /// Creates an action of `AActionClass` in `AActionList` named after its class and
  /// category, and selects it. A failure frees the new action and passes on.
  void CreateNewAction(TObject* Sender, const String& ACategory, TClass AActionClass,
                       TContainedActionList* AActionList);
  /// The view dropped down last; owned.
  TActionListView* ActionListView() const noexcept { return FActionListView.Get(); }

  // `IProperty80` brings its own copy of the operations of `IProperty`.
  void Activate() override { TComponentProperty::Activate(); }
  bool AllEqual() override { return TComponentProperty::AllEqual(); }
  bool AutoFill() override { return TComponentProperty::AutoFill(); }
  void Edit() override { TComponentProperty::Edit(); }
  bool HasInstance(TPersistent* Instance) override { return TComponentProperty::HasInstance(Instance); }
  int GetEditLimit() override { return TComponentProperty::GetEditLimit(); }
  bool GetEditValue(String& Value) override { return TComponentProperty::GetEditValue(Value); }
  String GetName() override { return TComponentProperty::GetName(); }
  void GetProperties(const TGetPropProc& Proc) override { TComponentProperty::GetProperties(Proc); }
  PPropInfo GetPropInfo() override { return TComponentProperty::GetPropInfo(); }
  PTypeInfo GetPropType() override { return TComponentProperty::GetPropType(); }
  String GetValue() override { return TComponentProperty::GetValue(); }
  void GetValues(const TGetStrProc& Proc) override { TComponentProperty::GetValues(Proc); }
  void Revert() override { TComponentProperty::Revert(); }
  void SetValue(const String& Value) override { TComponentProperty::SetValue(Value); }
  bool ValueAvailable() override { return TComponentProperty::ValueAvailable(); }

private:
  TObjectGuard<TActionListView> FActionListView;
  IPtr<IPropertyHost> FHost;
  struct TRegisteredAction {
    String Category;
    TClass ActionClass = nullptr;
  };
  std::vector<TRegisteredAction> FRegisteredActionList;
  bool FRegisteredActionsRead = false;
};

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

/// Joins the action registries to the core and, once it runs, points the runtime's
/// hooks at them, registers the framework "Kiln" and its standard actions; stopping
/// undoes it. Registers `TActionProperty` for action properties. The joining happens once.
FK_API void RegisterKilnActionEditors();

} // namespace formkit
