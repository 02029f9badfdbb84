//===- editors/SelectionEditors.cpp - Editors of a whole selection -------===//
#include "editors/SelectionEditors.h"

#include "core/TopLevels.h"
#include "editors/CustomModule.h"
#include "editors/EditorRegistry.h"

namespace formkit {

FK_IMPLEMENT(TSelectionEditor, "DesignEditors") {}
FK_IMPLEMENT(TSelectionEditorList, "DesignEditors") {}

void TSelectionEditor::Create(const IPtr<IDesigner>& ADesigner) {
  inherited::Create(ADesigner);
  FDesigner = ADesigner;
}

//===----------------------------------------------------------------------===//
// TEditActionSelectionEditor
//===----------------------------------------------------------------------===//

std::function<TComponent*()> GetIDEActionListFunc;

FK_IMPLEMENT(TEditActionSelectionEditor, "DesignEditors") {}

String TEditActionSelectionEditor::GetVerb(int Index) {
  switch (Index) {
  case 0: return LoadResString(sEditSubmenu);
  case 1: return LoadResString(sControlSubmenu);
  default: return String();
  }
}

namespace {
/// The host's command named `Name`, or null when it has none. Raises `EInvalidCast` for a
/// component of that name that is no action.
TComponent* HostCommand(const String& Name) {
  TComponent* List = GetIDEActionListFunc ? GetIDEActionListFunc() : nullptr;
  TComponent* Commands = List ? List->Owner() : nullptr;
  TComponent* Command = Commands ? Commands->FindComponent(Name) : nullptr;
  if (Command && !ClassInheritsFrom(Command->ClassType(), "TAction"))
    throw EInvalidCast(SInvalidCast);
  return Command;
}
} // namespace

void TEditActionSelectionEditor::PrepareItem(int Index, const IPtr<IMenuItem>& AItem) {
  static const char* const EditCommands[] = {"EditUndoCommand",   "-",
                                             "EditCutCommand",    "EditCopyCommand",
                                             "EditPasteCommand",  "EditDeleteCommand",
                                             "-",                 "EditSelectAllCommand"};
  static const char* const ControlCommands[] = {"AlignBringToFrontCommand", "AlignSendToBackCommand"};
  auto Fill = [&](auto& Names) {
    for (const char* Name : Names) {
      if (String(Name) == "-") AItem->AddLine(String());
      else if (TComponent* Command = HostCommand(Name)) AItem->AddItem(Command, String());
    }
  };
  if (Index == 0) Fill(EditCommands);
  else if (Index == 1) Fill(ControlCommands);
}

void TEditActionSelectionEditor::EditAction(TEditAction Action) {
  TComponent* TopLevel = GetTopLevelComponentFunc ? GetTopLevelComponentFunc(nullptr) : nullptr;
  if (auto Handler = InterfaceOf<IEditHandler>(TopLevel)) Handler->EditAction(Action);
  else if (auto Designer = QueryAs<IEditHandler>(FDesigner)) Designer->EditAction(Action);
}

TEditState TEditActionSelectionEditor::GetEditState() {
  if (auto Designer = QueryAs<IEditHandler>(FDesigner)) return Designer->GetEditState();
  TComponent* TopLevel = GetTopLevelComponentFunc ? GetTopLevelComponentFunc(nullptr) : nullptr;
  if (auto Handler = InterfaceOf<IEditHandler>(TopLevel)) return Handler->GetEditState();
  return {esCanUndo, esCanRedo, esCanCut, esCanCopy, esCanPaste, esCanDelete};
}

//===----------------------------------------------------------------------===//
// The list and the lookup
//===----------------------------------------------------------------------===//

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
