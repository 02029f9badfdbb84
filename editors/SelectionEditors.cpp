//===- editors/SelectionEditors.cpp - Editors of a whole selection -------===//
#include "editors/SelectionEditors.h"

#include "editors/EditorRegistry.h"

namespace formkit {

FK_IMPLEMENT(TSelectionEditor, "DesignEditors") {}
FK_IMPLEMENT(TSelectionEditorList, "DesignEditors") {}

void TSelectionEditor::Create(const IPtr<IDesigner>& ADesigner) {
  inherited::Create(ADesigner);
  FDesigner = ADesigner;
}

IPtr<ISelectionEditor> TSelectionEditorList::Get(int Index) {
  if (Index < 0 || Index >= GetCount()) throw EListError(SListIndexError, Index);
  return FEditors[static_cast<size_t>(Index)];
}

namespace {
/// The nearest class that every object of `Selections` descends from.
TClass NearestCommonAncestor(const IPtr<IDesignerSelections>& Selections) {
  TClass Common = Selections->Get(0)->ClassType();
  for (int I = 1; I < Selections->GetCount(); ++I) {
    TPersistent* Obj = Selections->Get(I);
    while (Common != TObject::StaticClass() && !Obj->InheritsFrom(Common)) Common = Common->Parent;
  }
  return Common;
}
} // namespace

IPtr<ISelectionEditorList> GetSelectionEditors(const IPtr<IDesigner>& ADesigner,
                                               const IPtr<IDesignerSelections>& ASelections) {
  IPtr<TSelectionEditorList> Result = New<TSelectionEditorList>();
  if (!ASelections || ASelections->GetCount() == 0) return Result;
  TClass Common = NearestCommonAncestor(ASelections);
  for (const auto& Def : SelectionEditorDefinitions()) {
    if (!Def->Matches(Common)) continue;
    detail::RequireEditorClass(Def->Editor(), TBaseSelectionEditor::StaticClass(), "selection editor");
    Result->Add(CastAs<ISelectionEditor>(NewFromClass<TBaseSelectionEditor>(Def->Editor(), ADesigner).Get()));
  }
  return Result;
}

IPtr<ISelectionEditorList> GetSelectionEditors(const IPtr<IDesigner>& ADesigner) {
  IPtr<IDesignerSelections> Current = CreateSelectionList();
  if (ADesigner) ADesigner->GetSelections(Current);
  return GetSelectionEditors(ADesigner, Current);
}

IPtr<ISelectionEditorList> GetSelectionEditors(const IPtr<IDesigner>& ADesigner, TComponent* AComponent) {
  IPtr<IDesignerSelections> One = CreateSelectionList();
  One->Add(AComponent);
  return GetSelectionEditors(ADesigner, One);
}

} // namespace formkit
