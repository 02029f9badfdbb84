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

std::size_t TSprigIndex::BucketOf(const TPersistent* AItem) noexcept {
  return (reinterpret_cast<std::uintptr_t>(AItem) >> 8) & 0xFF;
}

void TSprigIndex::Add(TSprig* ASprig) {
  std::unique_ptr<TBucket>& Bucket = FList[BucketOf(ASprig->Item())];
  if (!Bucket) Bucket = std::make_unique<TBucket>();
  Bucket->emplace_back(ASprig->Item(), ASprig);
}

void TSprigIndex::Remove(TSprig* ASprig) {
  std::unique_ptr<TBucket>& Bucket = FList[BucketOf(ASprig->Item())];
  if (!Bucket) return;
  std::erase_if(*Bucket, [&](const auto& Entry) { return Entry.second == ASprig; });
  if (Bucket->empty()) Bucket.reset();
}

TSprig* TSprigIndex::Find(const TPersistent* AItem) const {
  const std::unique_ptr<TBucket>& Bucket = FList[BucketOf(AItem)];
  if (!Bucket) return nullptr;
  auto It = std::find_if(Bucket->begin(), Bucket->end(), [&](const auto& Entry) { return Entry.first == AItem; });
  return It == Bucket->end() ? nullptr : It->second;
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
  if (ASprig->Item()) FIndex->Add(ASprig);
}

void TRootSprig::RemoveItem(TSprig* ASprig) {
  if (ASprig->Item() && FIndex) FIndex->Remove(ASprig);
  std::erase(FNamedItems, ASprig);
  std::erase(FPathedItems, ASprig);
}

//===----------------------------------------------------------------------===//
// Repopulation
//===----------------------------------------------------------------------===//

void TRootSprig::SweepTree(TSprig* ASprig, std::unordered_set<TPersistent*>& Shown) {
  if (!ASprig->Invalid() && ASprig->Item()) Shown.insert(ASprig->Item());
  for (int I = ASprig->Count() - 1; I >= 0; --I)
    if (I < ASprig->Count()) SweepTree(ASprig->Items(I), Shown);
  if (ASprig->Invalid() && ASprig != this) ASprig->Destroy();
}

namespace {
/// The root's own components that may have sprigs, in order.
std::vector<TComponent*> DesignedComponentsOf(TComponent* Root) {
  std::vector<TComponent*> Work;
  if (!Root) return Work;
  Work.reserve(static_cast<std::size_t>(Root->ComponentCount()));
  for (int I = 0; I < Root->ComponentCount(); ++I) {
    TComponent* C = Root->Components(I);
    if (C->ComponentStyle().Contains(csTransient)) continue;
    if (!C->ComponentState().Contains(csDesigning) || C->ComponentState().Contains(csDestroying)) continue;
    Work.push_back(C);
  }
  return Work;
}
} // namespace

bool TRootSprig::Repopulate() {
  if (!FRepopulateNeeded) return false;
  BeginUpdate();
  FRepopulating = true;
  // A failure leaves the bracket without announcing anything to the view.
  auto Undo = OnFailure([this]() noexcept {
    FRepopulating = false;
    --FUpdateLocks;
  });
  std::vector<TComponent*> Work = DesignedComponentsOf(dynamic_cast<TComponent*>(Item()));
  std::unordered_set<TPersistent*> Shown;
  SweepTree(this, Shown);
  bool Result = false;
  for (TComponent* C : Work) {
    if (Shown.contains(C)) continue;
    TSprigClass SprigClass = FindBestSprigClass(C->ClassType(), TComponentSprig::StaticClass());
    if (!SprigClass) continue;
    TObjectGuard<TSprig> Sprig = NewSprig(SprigClass, C);
    static_cast<TComponentSprig*>(Sprig.Get())->SetOwner(this);
    Add(Sprig.Release());
    Result = true;
  }
  const TSprigAction Validate = [this](TSprig* S) { ValidateParent(S); };
  do {
    FParentChanges = false;
    ForEach(Validate, nullptr);
  } while (FParentChanges);
  ClearUnneededSprigs();
  FExpanded = true;
  FRepopulateNeeded = false;
  FRepopulating = false;
  Undo.Dismiss();
  EndUpdate();
  return Result;
}

void TRootSprig::ValidateParent(TSprig* ASprig) {
  if (!ASprig || ASprig->Invalid()) return;
  TSprig* Before = ASprig->Parent();
  ASprig->FigureParent();
  if (ASprig->Parent() != Before) FParentChanges = true;
  ASprig->FigureChildren();
}

void TRootSprig::RefreshTreeView() {
  BeginUpdate();
  auto Undo = OnFailure([this]() noexcept { --FUpdateLocks; });
  if (FRepopulateNeeded) Repopulate();
  ForEach(nullptr, [this](TSprig* S) { PostRefreshTreeView(S); });
  Undo.Dismiss();
  EndUpdate();
}

//===----------------------------------------------------------------------===//
// Designer notifications
//===----------------------------------------------------------------------===//

void TRootSprig::ItemDeleted(TPersistent* AItem) {
  TSprig* Sprig = Find(AItem, true);
  if (!Sprig || Sprig == this || Sprig->Invalid()) return;
  Sprig->Invalidate();
  FRepopulateNeeded = true;
}

void TRootSprig::ItemsModified(bool ADoRepopulate) {
  if (ADoRepopulate) FRepopulateNeeded = true;
  ForEach(nullptr, [this](TSprig* S) { PostRefreshTreeView(S); });
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
