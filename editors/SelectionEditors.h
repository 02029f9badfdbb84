//===- editors/SelectionEditors.h - Editors of a whole selection ---------===//
//
// A selection editor adds verbs to the context menu of a selection and may filter
// the properties the inspector shows for it (`ISelectionPropertyFilter`). Every
// registration whose class the selection's nearest common ancestor descends from
// applies, in the order of registration.
//
// Example:
//   RegisterSelectionEditor(TControl::StaticClass(), TMyAlignEditor::StaticClass());
//   IPtr<ISelectionEditorList> Editors = GetSelectionEditors(Designer, Selection);
//   for (int I = 0; I < Editors->GetCount(); ++I) Editors->Get(I)->GetVerbCount();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

/// The base of selection editors: no verbs, no units. Counted; made through the virtual
/// constructor of `TBaseSelectionEditor`.
class FK_API TSelectionEditor : public TBaseSelectionEditor, public ISelectionEditor {
  FK_CLASS(TSelectionEditor, TBaseSelectionEditor)
  FK_INTERFACES(ISelectionEditor)
  /// Keeps the designer.
  void Create(const IPtr<IDesigner>& ADesigner) override;
  void ExecuteVerb(int, const IPtr<IDesignerSelections>&) override {}
  String GetVerb(int) override { return String(); }
  int GetVerbCount() override { return 0; }
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  /// Hands `Proc` the name of each unit the selection needs in the module's uses clause.
  void RequiresUnits(const TGetStrProc&) override {}
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }

protected:
  IPtr<IDesigner> FDesigner;
};

/// The selection editors made for one selection, in registration order.
class FK_API TSelectionEditorList : public TInterfacedObject, public ISelectionEditorList {
  FK_CLASS(TSelectionEditorList, TInterfacedObject)
  FK_INTERFACES(ISelectionEditorList)
  /// Raises `EListError` for an index out of range.
  IPtr<ISelectionEditor> Get(int Index) override;
  int GetCount() override { return static_cast<int>(FEditors.size()); }
  void Add(IPtr<ISelectionEditor> Editor) { FEditors.push_back(std::move(Editor)); }

private:
  std::vector<IPtr<ISelectionEditor>> FEditors;
};

/// A new editor of each registration that matches the nearest common ancestor of the
/// classes in `ASelections`, oldest registration first; an empty list for no selection.
FK_API IPtr<ISelectionEditorList> GetSelectionEditors(const IPtr<IDesigner>& ADesigner,
                                                      const IPtr<IDesignerSelections>& ASelections);
/// The same for the designer's current selection.
FK_API IPtr<ISelectionEditorList> GetSelectionEditors(const IPtr<IDesigner>& ADesigner);
/// The same for a selection of `AComponent` alone.
FK_API IPtr<ISelectionEditorList> GetSelectionEditors(const IPtr<IDesigner>& ADesigner, TComponent* AComponent);

} // namespace formkit
