//===- core/root/RootSelection.cpp - A root's selection and its instances -===//
#include "core/root/ComponentRoot.h"

#include "core/DesignNotifications.h"
#include "core/root/RootItems.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// TSelections
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TSelections, "ComponentDesigner") {}

TSelections::TSelections(const IPtr<ISelections>& Selections) : FSelections(Selections) {
  if (FSelections) {
    FSelections->AddListener(IPtr<ISelectionsListener>(this));
    DropOwnReference(); // the list's registration must not keep this object alive
  }
}

void TSelections::BeforeDestruction() {
  if (FSelections) FSelections->RemoveListener(IPtr<ISelectionsListener>(this));
  FSelections = nullptr;
  inherited::BeforeDestruction();
}

TPersistent* TSelections::GetPersistents(int Index) { return ExtractPersistent(FSelections->GetItems(Index)); }

IPtr<IItem> TSelections::FindItemFor(TPersistent* Instance) {
  for (int I = 0, N = GetCount(); I < N; ++I) {
    IPtr<IItem> Item = FSelections->GetItems(I);
    if (ExtractPersistent(Item) == Instance) return Item;
  }
  return nullptr;
}

void TSelections::SelectionChanged(const IPtr<ISelections>&) {
  if (FOnChanged) FOnChanged();
}

//===----------------------------------------------------------------------===//
// Reading the selection
//===----------------------------------------------------------------------===//

void TComponentRoot::GetSelections(const IPtr<IDesignerSelections>& List) {
  int Count = FSelections ? FSelections->GetCount() : 0;
  for (int I = 0; I < Count; ++I) List->Add(FSelections->GetPersistents(I));
  if (Count == 0 && !FAllowNoSelection && FRoot && List->GetCount() == 0) List->Add(FRoot);
}

IPtr<IDesignerSelections> TComponentRoot::GetSelection() {
  IPtr<IDesignerSelections> List = CreateSelectionList();
  GetSelections(List);
  return List;
}

TPersistent* TComponentRoot::SelectedPersistent() {
  return (FSelections && FSelections->GetCount() > 0) ? FSelections->GetPersistents(0) : nullptr;
}

TComponent* TComponentRoot::SelectedComponent() { return dynamic_cast<TComponent*>(SelectedPersistent()); }

bool TComponentRoot::IsRootSelected() { return FRoot && FindSelection(FRoot); }

IPtr<IItem> TComponentRoot::FindSelection(TPersistent* Persistent) {
  return FSelections ? FSelections->FindItemFor(Persistent) : nullptr;
}

bool TComponentRoot::IsAnchorSelection(TPersistent* Persistent) {
  return FSelections && FSelections->GetCount() >= 2 && FSelections->GetPersistents(0) == Persistent;
}

IPtr<IComponentEditor> TComponentRoot::GetComponentEditor() {
  if (!FSelections || FSelections->GetCount() != 1) return nullptr;
  auto Item = QueryAs<IInternalItem>(FSelections->Items()->GetItems(0));
  return Item ? Item->GetEditor() : nullptr;
}

//===----------------------------------------------------------------------===//
// Changing the selection
//===----------------------------------------------------------------------===//

void TComponentRoot::SetSelections(const IPtr<IDesignerSelections>& List) {
  IPtr<ISelections> Items = SelectionItems();
  if (!Items || Items->GetSelectionLevel() >= 1) return; // a list coming back from a listener
  Items->BeginSelections();
  try {
    Items->Clear();
    for (int I = 0; List && I < List->GetCount(); ++I) SelectComponent(List->Get(I), true);
  } catch (...) {
    Items->EndSelections();
    throw;
  }
  Items->EndSelections();
}

void TComponentRoot::SetSelection(const String& Name) {
  TComponent* Target = (FRoot && FRoot->Name() == Name) ? FRoot : (FRoot ? FRoot->FindComponent(Name) : nullptr);
  Select(Target, false);
}

void TComponentRoot::SelectComponent(TPersistent* Instance) {
  IPtr<IDesigner> Other = QueryAs<IDesigner>(FindRootDesigner(Instance));
  if (Other && Other->GetRoot() != FRoot) {
    Other->Activate();
    if (auto OtherRoot = QueryAs<IRoot>(Other)) OtherRoot->Show();
    Other->SelectComponent(Instance);
    return;
  }
  SelectComponent(Instance, false);
}

void TComponentRoot::SelectComponent(const IPtr<IDesignObject>& Instance) {
  if (auto Persistent = QueryAs<IDesignPersistent>(Instance)) SelectComponent(Persistent->GetPersistent());
}

void TComponentRoot::SelectComponent(TPersistent* Instance, bool Add) { Select(Instance, Add); }

void TComponentRoot::Select(TPersistent* Instance, bool Add) {
  IPtr<ISelections> Items = SelectionItems();
  if (!Instance || !Items || !FSurface) return;
  Items->BeginSelections();
  try {
    if (!Add) Items->Clear();
    auto* Component = dynamic_cast<TComponent*>(Instance);
    // A persistent that is no component (a collection's item, a font) has no place on
    // the surface, but the inspector still shows it when it is selected.
    IPtr<IItem> Item = Component ? FSurface->ItemFromComponent(Component) : NewAs<IItem, TNonControlItem>(Instance, AsDesigner());
    if (auto Internal = QueryAs<IInternalItem>(Item)) {
      Items->Add(Item);
      Internal->Show();
    }
  } catch (...) {
    Items->EndSelections();
    throw;
  }
  Items->EndSelections();
}

void TComponentRoot::ClearSelection() {
  if (IPtr<ISelections> Items = SelectionItems()) {
    Items->BeginSelections();
    Items->Clear();
    Items->EndSelections();
  }
  FAllowNoSelection = false;
}

void TComponentRoot::NoSelection() {
  IPtr<ISelections> Items = SelectionItems();
  if (!Items) return;
  Items->BeginSelections();
  Items->Clear();
  FAllowNoSelection = true;
  Items->EndSelections();
}

void TComponentRoot::SelectionsChanged() {
  if (FClosing) return;
  IPtr<ISelections> Items = SelectionItems();
  IPtr<IInterfaceList> Unmark = FMarkedItems;
  IPtr<IInterfaceList> Mark;
  IPtr<IGrabHandles> Handles = FSurface ? FSurface->GetGrabHandles() : nullptr;
  int Count = Items ? Items->GetCount() : 0;
  if (Count == 0) {
    if (Handles) Handles->AttachHandles(nullptr);
  } else if (Count == 1) {
    FAllowNoSelection = false;
    IPtr<IItem> Item = Items->GetItems(0);
    if (auto Internal = QueryAs<IInternalItem>(Item)) Internal->SetMarked(false);
    if (Handles) Handles->AttachHandles(Item);
  } else {
    FAllowNoSelection = false;
    Mark = NewAs<IInterfaceList, TInterfaceList>();
    for (int I = 0; I < Count; ++I) {
      IPtr<IInterface> Entry = QueryAs<IInterface>(Items->GetItems(I));
      Mark->Add(Entry);
      if (Unmark)
        for (int K = Unmark->GetCount() - 1; K >= 0; --K)
          if (SameItem(QueryAs<IItem>(Unmark->Get(K)), QueryAs<IItem>(Entry))) Unmark->Delete(K);
    }
    if (Handles) Handles->AttachHandles(nullptr);
  }
  for (int I = 0; Unmark && I < Unmark->GetCount(); ++I)
    if (auto Internal = QueryAs<IInternalItem>(Unmark->Get(I))) Internal->SetMarked(false);
  for (int I = 0; Mark && I < Mark->GetCount(); ++I)
    if (auto Internal = QueryAs<IInternalItem>(Mark->Get(I))) Internal->SetMarked(true);
  FDesigner->UpdateSelections();
  FMarkedItems = Mark;
}

//===----------------------------------------------------------------------===//
// Instances entering and leaving the module
//===----------------------------------------------------------------------===//

void TComponentRoot::Notification(TPersistent* AnObject, TOperation Operation) {
  if (Operation == opInsert) InstanceInserted(AnObject);
  else InstanceRemoved(AnObject);
}

void TComponentRoot::CanInsertComponent(TComponent*) {
  if (FIgnoreRename) return;
  if (IsView()) throw EComponentDesignerException(sCannotCreateComponentOnView);
}

void TComponentRoot::InstanceInserted(TPersistent* Instance) {
  FSelectableComponents.clear();
  // Another insertion ends the chance to undelete.
  if (!FInUndo) FreeUndoStream();
  for (auto& Listener : DesignNotificationListeners()) Listener->ItemInserted(AsDesigner(), Instance);
}

void TComponentRoot::InstanceRemoved(TPersistent* Instance) {
  FSelectableComponents.clear();
  if (FRootUpdateManager && TRootHooks::UpdateManagerRemoved) TRootHooks::UpdateManagerRemoved(FRootUpdateManager, Instance);
  IPtr<ISelections> Items = SelectionItems();
  if (Items) {
    Items->BeginSelections();
    if (IPtr<IItem> Item = FindSelection(Instance)) {
      if (FMarkedItems)
        for (int K = FMarkedItems->GetCount() - 1; K >= 0; --K)
          if (SameItem(QueryAs<IItem>(FMarkedItems->Get(K)), Item)) FMarkedItems->Delete(K);
      Items->Remove(Item);
      if (IPtr<IGrabHandles> Handles = FSurface ? FSurface->GetGrabHandles() : nullptr)
        if (SameItem(Handles->GetAttachedItem(), Item)) Handles->AttachHandles(nullptr);
    }
    Items->EndSelections();
  }
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->ItemDeleted(AsDesigner(), Instance);
  if (auto* Component = dynamic_cast<TComponent*>(Instance)) {
    if (IsModifiableFrame(Component) && FSurface)
      for (int I = 0; I < Component->ComponentCount(); ++I) FSurface->ItemRemoved(Component->Components(I));
    for (size_t I = FModifiableFrames.size(); I-- > 0;)
      if (FModifiableFrames[I] == Component) FModifiableFrames.erase(FModifiableFrames.begin() + static_cast<std::ptrdiff_t>(I));
    FInliningComponents.erase(Component);
  }
  for (auto& Listener : DesignNotificationListeners()) Listener->ItemDeleted(AsDesigner(), Instance);
  FreeRootStream();
}

void TComponentRoot::EditComponent(TComponent* Component) {
  IPtr<IInternalRoot> Holder;
  for (TComponent* C = Component; C; C = C->Owner())
    if (C == FRoot) Holder = IPtr<IInternalRoot>(this);
  if (!Holder && Component && Component->Owner())
    Holder = QueryAs<IInternalRoot>(FDesigner->FindRoot(Component->Owner()));
  auto* Target = Holder ? dynamic_cast<TComponentRoot*>(Holder->Implementor()) : nullptr;
  if (!Target) return;
  Target->Select(Component, false);
  Target->Edit(Component);
}

//===----------------------------------------------------------------------===//
// The flat list of the module's components
//===----------------------------------------------------------------------===//

namespace {
int CountOf(TComponent* C) {
  int N = C->ComponentCount();
  for (int I = 0; I < C->ComponentCount(); ++I)
    if (C->Components(I)->ComponentState().Contains(csInline)) N += CountOf(C->Components(I));
  return N;
}

/// Finds entry `Index` below `C`; `Path` gathers the nested frames passed through.
TComponent* Locate(TComponent* C, int& Index, String& Path) {
  int Own = C->ComponentCount();
  if (Index < Own) return C->Components(Index);
  Index -= Own;
  for (int I = 0; I < Own; ++I) {
    TComponent* Frame = C->Components(I);
    if (!Frame->ComponentState().Contains(csInline)) continue;
    String Inner;
    if (TComponent* Hit = Locate(Frame, Index, Inner)) {
      Path = Frame->Name() + "." + Inner;
      return Hit;
    }
  }
  return nullptr;
}
} // namespace

int TComponentRoot::GetCompCount() { return FRoot ? CountOf(FRoot) : 0; }

TComponent* TComponentRoot::CompIndexToComponent(int Index) {
  if (!FRoot) return nullptr;
  if (Index < 0) return FRoot;
  String Path;
  return Locate(FRoot, Index, Path);
}

String TComponentRoot::GetCompName(int Index) {
  if (!FRoot) return "";
  if (Index < 0) return FRoot->Name();
  String Path;
  TComponent* C = Locate(FRoot, Index, Path);
  return C ? Path + C->Name() : "";
}

String TComponentRoot::GetCompType(int Index) {
  TComponent* C = CompIndexToComponent(Index);
  return C ? C->ClassName() : "";
}

String TComponentRoot::FindCompClass(const String& Name) {
  TComponent* C = FRoot ? FRoot->FindComponent(Name) : nullptr;
  return (C && !C->ComponentState().Contains(csAncestor)) ? C->QualifiedClassName() : "";
}

} // namespace formkit
