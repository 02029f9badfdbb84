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

#include <functional>

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

FK_RESOURCESTRING(sEditSubmenu, "Edit");
FK_RESOURCESTRING(sControlSubmenu, "Control");

/// The host's action list, whose owner holds the environment's commands by name
/// ("EditCutCommand"); null unless a host sets it.
FK_API extern std::function<TComponent*()> GetIDEActionListFunc;

/// The edit commands of every selection: an "Edit" submenu of the host's undo, clipboard,
/// delete and select-all commands, and a "Control" submenu of its stacking commands.
/// Registered for `TPersistent` as the library starts.
class FK_API TEditActionSelectionEditor : public TSelectionEditor {
  FK_CLASS(TEditActionSelectionEditor, TSelectionEditor)
  int GetVerbCount() override { return 2; }
  /// `sEditSubmenu` and `sControlSubmenu`.
  String GetVerb(int Index) override;
  /// Fills verb 0 with the host's edit commands, verb 1 with its stacking commands; a
  /// command the host does not have is left out.
  void PrepareItem(int Index, const IPtr<IMenuItem>& AItem) override;
  /// Hands `Action` to the host's top-level window when it takes edit commands, else to
  /// the designer when it does; else nothing.
  void EditAction(TEditAction Action);
  /// The designer's edit state when it answers, else the top-level window's; all of undo,
  /// redo, cut, copy, paste and delete when neither does.
  TEditState GetEditState();
  void HandleUndo(TObject*) { EditAction(eaUndo); }
  void HandleCut(TObject*) { EditAction(eaCut); }
  void HandleCopy(TObject*) { EditAction(eaCopy); }
  void HandlePaste(TObject*) { EditAction(eaPaste); }
  void HandleDelete(TObject*) { EditAction(eaDelete); }
  void HandleSelectAll(TObject*) { EditAction(eaSelectAll); }
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
