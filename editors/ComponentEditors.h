//===- editors/ComponentEditors.h - A component's default action and verbs ===//
//
// A component editor gives one component a default action (what a double click on
// it does on a surface) and a list of verbs for the host's context menu. Design
// packages derive from `TComponentEditor` and register the class for a component
// class; a component whose class has no registration gets `TDefaultEditor`, whose
// default action opens the event a user most likely wants: OnCreate, OnChange,
// OnChanged, OnClick, else the first event by name.
//
// Example:
//   class TMyGridEditor : public TComponentEditor {
//     FK_CLASS(TMyGridEditor, TComponentEditor)
//     int GetVerbCount() override { return 1; }
//     String GetVerb(int) override { return "Columns..."; }
//     void ExecuteVerb(int) override { ... }
//   };
//   RegisterComponentEditor(TMyGrid::StaticClass(), TMyGridEditor::StaticClass());
//   GetComponentEditor(Grid1, Designer)->Edit();   // runs verb 0
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

/// The base of component editors. Holds the component without owning it, and the
/// designer counted. Counted; made through the virtual constructor.
class FK_API TComponentEditor : public TBaseComponentEditor, public IComponentEditor {
  FK_CLASS(TComponentEditor, TBaseComponentEditor)
  FK_INTERFACES(IComponentEditor)

  /// Keeps the component and the designer.
  void Create(TComponent* AComponent, const IPtr<IDesigner>& ADesigner) override;
  /// The default action: verb 0 when there is one.
  void Edit() override;
  /// Carries out verb `Index`; nothing in the base.
  void ExecuteVerb(int) override {}
  /// The caption of verb `Index`, 0 to `GetVerbCount` - 1; empty in the base.
  String GetVerb(int) override { return String(); }
  /// The number of verbs; none in the base.
  int GetVerbCount() override { return 0; }
  /// Acts on a copy of the component; nothing in the base, and nothing here calls it.
  void Copy() override {}
  /// Adjusts the menu item of verb `Index`; nothing in the base.
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  /// Whether the component lives in a nested frame: its owner is inline. The component
  /// must have an owner.
  bool IsInInlined() override;
  TComponent* GetComponent() override { return FComponent; }
  IPtr<IDesigner> GetDesigner() override { return FDesigner; }

protected:
  /// Plain reference: the editor lives no longer than its item or its module.
  TComponent* FComponent = nullptr;
  IPtr<IDesigner> FDesigner;
};

/// The editor of a component without a registration: its default action opens an event.
class FK_API TDefaultEditor : public TComponentEditor, public IDefaultEditor {
  FK_CLASS(TDefaultEditor, TComponentEditor)
  FK_INTERFACES(IDefaultEditor)

  /// Offers every property of the component to `EditProperty`, then edits the best event
  /// found, or else the first event by name; nothing for a component without events.
  void Edit() override;
  // `IDefaultEditor` brings its own copy of the operations of `IComponentEditor`: each is
  // answered by the one of `TComponentEditor`.
  void ExecuteVerb(int Index) override { TComponentEditor::ExecuteVerb(Index); }
  String GetVerb(int Index) override { return TComponentEditor::GetVerb(Index); }
  int GetVerbCount() override { return TComponentEditor::GetVerbCount(); }
  void Copy() override { TComponentEditor::Copy(); }
  void PrepareItem(int Index, const IPtr<IMenuItem>& AItem) override { TComponentEditor::PrepareItem(Index, AItem); }
  bool IsInInlined() override { return TComponentEditor::IsInInlined(); }
  TComponent* GetComponent() override { return TComponentEditor::GetComponent(); }
  IPtr<IDesigner> GetDesigner() override { return TComponentEditor::GetDesigner(); }
  /// Keeps the first event seen and the best by the order of preference; set `Continue`
  /// to false to stop the search, and the final edit with it.
  virtual void EditProperty(const IPtr<IProperty>& PropertyEditor, bool& Continue);

private:
  void CheckEdit(const IPtr<IProperty>& Prop);
  void ReplaceBest(const IPtr<IProperty>& PropertyEditor);

  IPtr<IProperty> FFirst;
  IPtr<IProperty> FBest;
  bool FContinue = false;
};

/// The editor of `Component`: of the most derived registered class it is an instance of
/// (of several registrations for one class, the newest), else `TDefaultEditor`.
FK_API IPtr<IComponentEditor> GetComponentEditor(TComponent* Component, const IPtr<IDesigner>& Designer);

} // namespace formkit
