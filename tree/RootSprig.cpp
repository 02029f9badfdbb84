//===- tree/RootSprig.cpp - The root of a structure tree and its upkeep --===//
//
// The index of sprigs by item, the root's searches with their caches, the
// lazy repopulation with its fixed-point parenting, the update bracket towards
// the host's view, and the edit actions on the view's selection.
//
//===----------------------------------------------------------------------===//
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

#include "platform/ScopeGuard.h"

#include <algorithm>
#include <unordered_set>

namespace formkit {

FK_IMPLEMENT(TSprigIndex, "TreeIntf") {}
FK_IMPLEMENT(TRootSprig, "TreeIntf") {}

//===----------------------------------------------------------------------===//
// TSprigIndex
//===----------------------------------------------------------------------===//

void TSprigIndex::Add(TSprig* ASprig) {
  TEntry& Entry = FList[ASprig->Item()];
  if (!Entry.First) {
    Entry.First = ASprig;
    return;
  }
  if (!Entry.More) Entry.More = std::make_unique<std::vector<TSprig*>>();
  Entry.More->push_back(ASprig);
}

void TSprigIndex::Remove(TSprig* ASprig) {
  auto It = FList.find(ASprig->Item());
  if (It == FList.end()) return;
  TEntry& Entry = It->second;
  if (Entry.First != ASprig) {
    if (Entry.More) std::erase(*Entry.More, ASprig);
    return;
  }
  if (!Entry.More || Entry.More->empty()) {
    FList.erase(It);
    return;
  }
  Entry.First = Entry.More->front();
  Entry.More->erase(Entry.More->begin());
}

TSprig* TSprigIndex::Find(const TPersistent* AItem) const {
  auto It = FList.find(AItem);
  return It == FList.end() ? nullptr : It->second.First;
}

//===----------------------------------------------------------------------===//
// Construction, designer and selection
//===----------------------------------------------------------------------===//

void TRootSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  FRoot = this;
  FIndex = std::make_unique<TSprigIndex>();
  FRepopulateNeeded = true;
}

bool TRootSprig::AcceptsClass(TClass AClass) {
  return AClass && AClass->InheritsFrom(TComponent::StaticClass());
}

void TRootSprig::RuntimeChange() {
  if (FDesigner) FDesigner->Modified();
}

void TRootSprig::SelectItems(const std::vector<TPersistent*>& AItems, bool ARuntimeChange) {
  if (!FDesigner) return;
  if (ARuntimeChange) FDesigner->Modified();
  IPtr<TDesignerSelections> List = New<TDesignerSelections>();
  for (TPersistent* P : AItems) List->Add(P);
  FDesigner->SetSelections(InterfaceOf<IDesignerSelections>(List.Get()));
}

bool TRootSprig::GetDesigner(IPtr<IDesigner>& ADesigner) {
  ADesigner = FDesigner;
  return static_cast<bool>(FDesigner);
}

//===----------------------------------------------------------------------===//
// Searches
//===----------------------------------------------------------------------===//

TSprig* TRootSprig::FindItem(TPersistent* AItem, bool ARecurse) {
  if (!AItem) return nullptr;
  if (AItem == Item()) return this;
  return ARecurse ? FIndex->Find(AItem) : TSprig::FindItem(AItem, false);
}

namespace {
/// The first of `Cache` that `Matches`, or null.
TSprig* FindCached(const std::vector<TSprig*>& Cache, const std::function<bool(TSprig*)>& Matches) {
  auto It = std::find_if(Cache.begin(), Cache.end(), Matches);
  return It == Cache.end() ? nullptr : *It;
}
} // namespace

TSprig* TRootSprig::FindItemByName(const String& AName, TClass AClass, bool ARecurse) {
  if (AName.empty()) return nullptr;
  auto Matches = [&](TSprig* S) {
    return SameText(S->Name(), AName) && (!AClass || (S->Item() && S->Item()->InheritsFrom(AClass)));
  };
  if (Matches(this)) return this;
  if (TSprig* Hit = FindCached(FNamedItems, Matches)) return Hit;
  TSprig* Found = TSprig::FindItemByName(AName, AClass, ARecurse);
  if (Found) FNamedItems.push_back(Found);
  return Found;
}

TSprig* TRootSprig::FindItemByPath(const String& APath, bool ARecurse) {
  if (APath.empty()) return nullptr;
  auto Matches = [&](TSprig* S) { return SameText(S->Path(), APath); };
  if (Matches(this)) return this;
  if (TSprig* Hit = FindCached(FPathedItems, Matches)) return Hit;
  TSprig* Found = TSprig::FindItemByPath(APath, ARecurse);
  if (Found) FPathedItems.push_back(Found);
  return Found;
}

void TRootSprig::AddItem(TSprig* ASprig) {
  ++FAttached;
  ++FPassAttached;
  TPersistent* Item = ASprig->Item();
  if (!Item) return;
  FIndex->Add(ASprig);
  if (ASprig->SortByIndex()) FSortedSprigs.insert(ASprig);
  // Sprigs that were left elsewhere for want of this one move under it at the next read.
  if (FWaiting.empty()) return;
  auto It = FWaiting.find(Item);
  if (It == FWaiting.end()) return;
  std::vector<const TPersistent*> Waiting = std::move(It->second);
  FWaiting.erase(It);
  for (const TPersistent* Child : Waiting)
    if (TSprig* Sprig = FIndex->Find(Child)) FigureAgain(Sprig);
}

void TRootSprig::RemoveItem(TSprig* ASprig) {
  if (ASprig != this && FAttached > 0) --FAttached;
  if (ASprig->Item() && FIndex) FIndex->Remove(ASprig);
  FSortedSprigs.erase(ASprig);
  std::erase(FNamedItems, ASprig);
  std::erase(FPathedItems, ASprig);
}

//===----------------------------------------------------------------------===//
// Repopulation
//===----------------------------------------------------------------------===//

void TRootSprig::SweepTree(TSprig* ASprig) {
  for (int I = ASprig->Count() - 1; I >= 0; --I)
    if (I < ASprig->Count()) SweepTree(ASprig->Items(I));
  if (ASprig->Invalid() && ASprig != this) ASprig->Destroy();
}

namespace {
/// Whether a component of the module has a place in its tree.
bool ShowsInTree(const TComponent* C) {
  return !C->ComponentStyle().Contains(csTransient) && C->ComponentState().Contains(csDesigning) &&
         !C->ComponentState().Contains(csDestroying);
}

/// The root's own components that may have sprigs, in order.
std::vector<TComponent*> DesignedComponentsOf(TComponent* Root) {
  std::vector<TComponent*> Work;
  if (!Root) return Work;
  Work.reserve(static_cast<std::size_t>(Root->ComponentCount()));
  for (int I = 0; I < Root->ComponentCount(); ++I)
    if (TComponent* C = Root->Components(I); ShowsInTree(C)) Work.push_back(C);
  return Work;
}
} // namespace

bool TRootSprig::Repopulate() {
  if (!FRepopulateNeeded) return false;
  BeginUpdate();
  FRepopulating = true;
  // A failure leaves the bracket without announcing anything to the view, and the next
  // read goes over the whole module.
  auto Undo = OnFailure([this]() noexcept {
    FRepopulating = false;
    FRepopulateAll = true;
    --FUpdateLocks;
  });
  const bool Result = FRepopulateAll ? RepopulateAll() : RepopulateNoted();
  FExpanded = true;
  FRepopulateNeeded = false;
  FRepopulating = false;
  Undo.Dismiss();
  EndUpdate();
  return Result;
}

TSprig* TRootSprig::NewComponentSprig(TComponent* AComponent, TClassMemo& Memo) {
  // Components come in runs of a few classes: the registry is asked once per class.
  TClass Class = AComponent->ClassType();
  auto Known = std::find_if(Memo.begin(), Memo.end(), [&](const auto& Entry) { return Entry.first == Class; });
  TSprigClass SprigClass = Known != Memo.end() ? Known->second : nullptr;
  if (Known == Memo.end()) {
    SprigClass = FindBestSprigClass(Class, TComponentSprig::StaticClass());
    Memo.emplace_back(Class, SprigClass);
  }
  if (!SprigClass) return nullptr;
  TObjectGuard<TSprig> Sprig = NewSprig(SprigClass, AComponent);
  static_cast<TComponentSprig*>(Sprig.Get())->SetOwner(this);
  return Add(Sprig.Release());
}

bool TRootSprig::RepopulateAll() {
  ClearNotes(); // the whole module is read: every note is answered by that
  FWaiting.clear();
  std::vector<TComponent*> Work = DesignedComponentsOf(dynamic_cast<TComponent*>(Item()));
  SweepTree(this);
  FIndex->Reserve(Work.size());
  TClassMemo Memo;
  bool Result = false;
  for (TComponent* C : Work)
    if (!FIndex->Find(C) && NewComponentSprig(C, Memo)) Result = true;
  ValidateAll();
  ClearUnneededSprigs();
  ClearNotes();
  FRepopulateAll = false;
  FUnverified = false;
  return Result;
}

bool TRootSprig::RepopulateNoted() {
  FreeInvalidSprigs();
  std::vector<TPersistent*> Inserted = std::exchange(FInserted, {});
  std::unordered_set<const TPersistent*> Live = std::exchange(FInsertedLive, {});
  auto* RootComponent = dynamic_cast<TComponent*>(Item());
  TClassMemo Memo;
  std::vector<TSprig*> Fresh;
  for (TPersistent* P : Inserted) {
    if (Live.erase(P) == 0) continue; // deleted since, or noted twice
    TComponent* C = detail::AsComponent(P);
    if (!C || FIndex->Find(C) || !ShowsInTree(C)) continue;
    if (C->Owner() != RootComponent) {
      // A component of a nested frame: the frame's sprig shows it.
      if (TSprig* OwnerSprig = C->Owner() ? FIndex->Find(C->Owner()) : nullptr) FigureAgain(OwnerSprig);
      continue;
    }
    if (TSprig* Sprig = NewComponentSprig(C, Memo)) Fresh.push_back(Sprig);
  }
  const bool Result = !Fresh.empty();
  // Figuring may give a waiting sprig its parent, and so note more: until none is left.
  do {
    std::vector<TSprig*> Changed = std::exchange(FChanged, {});
    std::erase_if(Changed, [&](TSprig* S) { return std::find(Fresh.begin(), Fresh.end(), S) != Fresh.end(); });
    ValidateNoted(Fresh, Changed);
    Fresh.clear();
  } while (!FChanged.empty());
  FreeInvalidSprigs();
  return Result;
}

void TRootSprig::ValidateParent(TSprig* ASprig) {
  if (!ASprig || ASprig->Invalid()) return;
  if (ASprig != this && ASprig->FValidatedPass != FPass) {
    ASprig->FValidatedPass = FPass;
    ++FPassFigured;
  }
  TSprig* Before = ASprig->Parent();
  ASprig->FigureParent();
  if (ASprig->Parent() != Before) FParentChanges = true;
  NoteWaiting(ASprig);
  ASprig->FigureChildren();
}

void TRootSprig::ValidateWalk(TSprig* ASprig) {
  if (ASprig->Invalid()) return;
  TSprig* Before = ASprig->Parent();
  ValidateParent(ASprig);
  // A sprig that moved is walked again under its new parent, later in this pass or in
  // the next one, which its move asks for.
  if (ASprig->Parent() != Before) return;
  for (int I = ASprig->Count() - 1; I >= 0; --I)
    if (I < ASprig->Count()) ValidateWalk(ASprig->Items(I));
}

void TRootSprig::ValidateAll() {
  do {
    FParentChanges = false;
    ++FPass;
    FPassFigured = FPassAttached = 0;
    ValidateParent(this);
    // The root's own children from the last: one that moves away leaves a hole, closed
    // when the pass ends, so that a move costs the same at any place of a long list.
    auto Close = Finally([this]() noexcept {
      FVisiting = -1;
      if (FList) std::erase(*FList, nullptr);
    });
    for (int I = Count() - 1; I >= 0; --I) {
      if (I >= Count()) continue;
      TSprig* Child = (*FList)[static_cast<std::size_t>(I)];
      if (!Child) continue;
      FVisiting = I;
      ValidateWalk(Child);
    }
    // A parent is found through the index, not through the tree's shape: a pass that
    // figured every sprig and attached none would figure the same parents again.
    if (FPassAttached == 0 && FPassFigured == FAttached) break;
  } while (FParentChanges);
}

void TRootSprig::ValidateNoted(const std::vector<TSprig*>& AFresh, const std::vector<TSprig*>& AChanged) {
  do {
    FParentChanges = false;
    for (TSprig* Sprig : AChanged) {
      if (Sprig->Invalid()) continue;
      ValidateParent(Sprig);
      // A collection's new items are figured with it; a component's children stay.
      if (Sprig->SortByIndex())
        for (int I = Sprig->Count() - 1; I >= 0; --I)
          if (I < Sprig->Count()) ValidateWalk(Sprig->Items(I));
    }
    for (std::size_t I = AFresh.size(); I-- > 0;) ValidateWalk(AFresh[I]);
  } while (FParentChanges);
}

void TRootSprig::RefreshTreeView() {
  BeginUpdate();
  auto Undo = OnFailure([this]() noexcept { --FUpdateLocks; });
  if (FUnverified) FRepopulateNeeded = FRepopulateAll = true;
  if (FRepopulateNeeded) Repopulate();
  ForEach(nullptr, [this](TSprig* S) { PostRefreshTreeView(S); });
  Undo.Dismiss();
  EndUpdate();
}

//===----------------------------------------------------------------------===//
// Pending work
//===----------------------------------------------------------------------===//

void TRootSprig::FigureAgain(TSprig* ASprig) {
  if (!ASprig || ASprig->Invalid() || ASprig == this) return;
  FRepopulateNeeded = true;
  if (FRepopulateAll || std::find(FChanged.begin(), FChanged.end(), ASprig) != FChanged.end()) return;
  FChanged.push_back(ASprig);
}

void TRootSprig::NoteInvalid(TSprig* ASprig) {
  FInvalidSprigs.insert(ASprig);
  FRepopulateNeeded = true;
}

void TRootSprig::SprigGone(TSprig* ASprig) noexcept {
  FInvalidSprigs.erase(ASprig);
  std::erase(FChanged, ASprig);
}

void TRootSprig::FreeInvalidSprigs() {
  while (!FInvalidSprigs.empty()) {
    TSprig* Sprig = *FInvalidSprigs.begin();
    FInvalidSprigs.erase(FInvalidSprigs.begin());
    TSprig* Parent = Sprig->Parent();
    Sprig->Destroy();
    // A transient sprig lives only while it has children.
    while (Parent && Parent != this && Parent->Transient() && Parent->Count() == 0) {
      TSprig* Up = Parent->Parent();
      Parent->Destroy();
      Parent = Up;
    }
  }
}

void TRootSprig::NoteWaiting(TSprig* ASprig) {
  // Only a sprig that fell back to the root or its owner can be waiting for a parent.
  TSprig* Parent = ASprig->Parent();
  if (ASprig == this || !Parent || (Parent != this && Parent != ASprig->Owner())) return;
  TComponent* Component = detail::AsComponent(ASprig->Item());
  TComponent* ParentComponent = Component ? Component->GetParentComponent() : nullptr;
  if (!ParentComponent || Parent->Item() == ParentComponent || FIndex->Find(ParentComponent)) return;
  std::vector<const TPersistent*>& Waiting = FWaiting[ParentComponent];
  if (std::find(Waiting.begin(), Waiting.end(), Component) == Waiting.end()) Waiting.push_back(Component);
}

void TRootSprig::ClearNotes() noexcept {
  FInserted.clear();
  FInsertedLive.clear();
  FChanged.clear();
  FInvalidSprigs.clear();
}

//===----------------------------------------------------------------------===//
// Designer notifications
//===----------------------------------------------------------------------===//

void TRootSprig::ItemDeleted(TPersistent* AItem) {
  FInsertedLive.erase(AItem);
  FWaiting.erase(AItem);
  TSprig* Sprig = Find(AItem, true);
  if (!Sprig || Sprig == this || Sprig->Invalid()) return;
  Sprig->Invalidate(); // notes itself for the next read
  FRepopulateNeeded = true;
}

void TRootSprig::ItemInserted(TPersistent* AItem) {
  FRepopulateNeeded = true;
  if (FRepopulateAll || !AItem) return;
  if (FInsertedLive.insert(AItem).second) FInserted.push_back(AItem);
}

void TRootSprig::ItemInserted() { FRepopulateNeeded = FRepopulateAll = true; }

void TRootSprig::ItemsModified(bool ADoRepopulate) {
  // A copy: sorting drops the sprigs of items that left a collection.
  const std::vector<TSprig*> Sorted(FSortedSprigs.begin(), FSortedSprigs.end());
  for (TSprig* Sprig : Sorted)
    if (!Sprig->Invalid()) PostRefreshTreeView(Sprig);
  if (!ADoRepopulate) return;
  FRepopulateNeeded = true;
  // What changed is not told: most likely the selection, which the designer edits, and
  // the collections, whose items come and go without notice. A change elsewhere waits for
  // the next refresh.
  FUnverified = true;
  for (TSprig* Sprig : Sorted) FigureAgain(Sprig);
  if (!FDesigner) return;
  IPtr<TDesignerSelections> Selected = New<TDesignerSelections>();
  FDesigner->GetSelections(InterfaceOf<IDesignerSelections>(Selected.Get()));
  for (int I = 0; I < Selected->GetCount(); ++I) FigureAgain(Find(Selected->Get(I), true));
}

//===----------------------------------------------------------------------===//
// The update bracket
//===----------------------------------------------------------------------===//

void TRootSprig::EnsureUpdate() {
  if (FUpdateLocks >= 1) FNeedUpdate = true;
}

void TRootSprig::EndUpdate() {
  if (FUpdateLocks <= 0) return;
  if (--FUpdateLocks != 0 || !FNeedUpdate) return;
  IPtr<IOTAStructureView> View = IDEService<IOTAStructureView>();
  if (!View || !FStructureContext) return;
  if (!SameObject(View->GetCurrentContext().Get(), FStructureContext.Get())) return; // retried at the next end
  IPtr<TDesignerSelections> Selected = New<TDesignerSelections>();
  if (FDesigner) FDesigner->GetSelections(InterfaceOf<IDesignerSelections>(Selected.Get()));
  View->StructureChanged(false);
  // The view lost its selection while it rebuilt: give it the designer's back.
  if (!View->GetFirstSelected() && Selected->GetCount() > 0)
    for (int I = 0; I < Selected->GetCount(); ++I) {
      TSprig* Sprig = Find(Selected->Get(I), true);
      if (Sprig && !Sprig->Invalid() && Sprig->StructureNode()) View->SelectNode(Sprig->StructureNode());
    }
  FNeedUpdate = false;
}

//===----------------------------------------------------------------------===//
// The tree's editor
//===----------------------------------------------------------------------===//

TCustomTreeView* TRootSprig::TreeView() { return FSprigDesigner ? FSprigDesigner->GetTreeView() : nullptr; }

void TRootSprig::DepopulateTreeView(TSprig* ASprig) {
  TTreeNode* Node = ASprig->TreeNode();
  ASprig->SetExpanded(Node && Node->Expanded() && Node->IsVisible());
  ASprig->ClearTreeNode();
}

void TRootSprig::SetSprigDesigner(const IPtr<ISprigDesigner>& ASprigDesigner) {
  if (FSprigDesigner) {
    ForEach(nullptr, [this](TSprig* S) { DepopulateTreeView(S); });
    IPtr<ISprigDesigner> Old = std::exchange(FSprigDesigner, nullptr);
    Old->SetRootSprig(nullptr);
  }
  FSprigDesigner = ASprigDesigner;
  FUpdateLocks = 0;
  FNeedUpdate = false;
  if (FSprigDesigner) RefreshTreeView();
}

void TRootSprig::BeforeDestruction() {
  BeginDestruction();
  SetSprigDesigner(nullptr);
  FStructureContext = nullptr;
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// The host view's selection
//===----------------------------------------------------------------------===//

void TRootSprig::ForEachSelectedSprig(const std::function<void(TSprig*)>& Fn) {
  IPtr<IOTAStructureView> View = IDEService<IOTAStructureView>();
  if (!View) return;
  for (IPtr<IOTAStructureNode> Node = View->GetFirstSelected(); Node; Node = View->GetNextSelected(Node))
    if (IPtr<ISprig> S = QueryAs<ISprig>(Node))
      if (TSprig* Sprig = S->GetSprig()) Fn(Sprig);
}

bool TRootSprig::SelectedSprig(TSprig*& ASprig) {
  ASprig = nullptr;
  IPtr<IOTAStructureView> View = IDEService<IOTAStructureView>();
  if (!View || View->GetSelectedCount() != 1) return false;
  IPtr<IOTAStructureNode> Node = View->GetFirstSelected();
  if (!Node || SameObject(Node.Get(), StructureNode().Get())) return false;
  IPtr<ISprig> S = QueryAs<ISprig>(Node);
  ASprig = S ? S->GetSprig() : nullptr;
  return ASprig != nullptr;
}

bool TRootSprig::CanMove(bool AUp) {
  TSprig* S = nullptr;
  return SelectedSprig(S) && S->CanMove(AUp);
}
bool TRootSprig::Move(bool AUp) {
  TSprig* S = nullptr;
  return SelectedSprig(S) && S->Move(AUp);
}
bool TRootSprig::CanAdd() {
  TSprig* S = nullptr;
  return SelectedSprig(S) && S->CanAdd();
}
int TRootSprig::AddTypeCount() {
  TSprig* S = nullptr;
  return SelectedSprig(S) ? S->AddTypeCount() : 0;
}
void TRootSprig::AddType(int AIndex) {
  TSprig* S = nullptr;
  if (SelectedSprig(S)) S->AddType(AIndex);
}
String TRootSprig::GetAddType(int AIndex) {
  TSprig* S = nullptr;
  return SelectedSprig(S) ? S->GetAddType(AIndex) : String();
}

void TRootSprig::SelectionSurvey(TSprigDeleteStyle& ADeleteStyle, bool& AAllVisible) {
  AAllVisible = true;
  bool SomeAbort = false, AllNormal = true, AllCustom = true;
  ForEachSelectedSprig([&](TSprig* S) {
    AAllVisible = AAllVisible && !S->Hidden();
    switch (S->DeleteStyle()) {
    case dsNormal: AllCustom = false; break;
    case dsAbort: SomeAbort = true; break;
    case dsCustom: AllNormal = false; break;
    case dsIgnore: break;
    }
  });
  ADeleteStyle = SomeAbort ? dsAbort : AllNormal ? dsNormal : AllCustom ? dsCustom : dsAbort;
}

bool TRootSprig::CustomDeleteSelection() {
  bool Result = false;
  TSprig* Last = nullptr;
  ForEachSelectedSprig([&](TSprig* S) {
    Result = S->CustomDelete() || Result;
    if (!S->Invalid()) Last = S;
  });
  if (!Result) return false;
  if (Last && Last->Item()) SelectItems({Last->Item()}, true);
  else RuntimeChange();
  return true;
}

bool TRootSprig::EditAction(TEditAction AAction) {
  IPtr<IEditHandler> Handler = QueryAs<IEditHandler>(FDesigner);
  if (!Handler) return false;
  if (AAction != eaCut && AAction != eaCopy && AAction != eaDelete) return Handler->EditAction(AAction);
  TSprigDeleteStyle Style = dsNormal;
  bool AllVisible = true;
  SelectionSurvey(Style, AllVisible);
  if (AAction == eaDelete) {
    if (Style == dsNormal) {
      FDesigner->DeleteSelection(true);
      return true;
    }
    return Style == dsCustom && CustomDeleteSelection();
  }
  return Style == dsNormal && AllVisible && Handler->EditAction(AAction);
}

TEditState TRootSprig::GetEditState() {
  IPtr<IEditHandler> Handler = QueryAs<IEditHandler>(FDesigner);
  if (!Handler) return {};
  TEditState State = Handler->GetEditState() - TEditState{esCanEditOle, esCanCreateTemplate};
  TSprigDeleteStyle Style = dsNormal;
  bool AllVisible = true;
  SelectionSurvey(Style, AllVisible);
  if (Style == dsAbort) State = State - TEditState{esCanDelete};
  if (!AllVisible) State = State - TEditState{esCanCut, esCanCopy, esCanPaste};
  return State;
}

} // namespace formkit
