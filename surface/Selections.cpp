//===- surface/Selections.cpp - The surface-level selection list ---------===//
//
// `TSimpleSelections` and its listener helper. A batch sends at most one
// notification, and none when nothing was touched.
//
// Example:
//   Sel->BeginSelections();
//   Sel->Clear(); Sel->Add(A); Sel->Add(B);
//   Sel->EndSelections();                     // listeners hear once
//
//===----------------------------------------------------------------------===//
#include "surface/Designer.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TSelectionListenerHelper, "Designer") {}

void TSelectionListenerHelper::AddListener(const IPtr<ISelectionsListener>& Listener) {
  FList.push_back(Listener);
}

void TSelectionListenerHelper::RemoveListener(const IPtr<ISelectionsListener>& Listener) {
  auto It = std::find(FList.begin(), FList.end(), Listener);
  if (It != FList.end()) FList.erase(It);
}

void TSelectionListenerHelper::SelectionChanged(const IPtr<ISelections>& Selections) {
  const size_t Count = FList.size();
  for (size_t I = 0; I < Count && I < FList.size(); ++I) {
    IPtr<ISelectionsListener> Listener = FList[I]; // alive through the call
    Listener->SelectionChanged(Selections);
  }
}

FK_IMPLEMENT(TSimpleSelections, "Designer") {}

TSimpleSelections::TSimpleSelections() : FListeners(new TSelectionListenerHelper) {}

void TSimpleSelections::BeforeDestruction() {
  FListeners.Reset();
  inherited::BeforeDestruction();
}

int TSimpleSelections::IndexOf(const IPtr<IItem>& Item) {
  TPersistent* Persistent = ExtractPersistent(Item);
  if (Persistent && FOtherCount == 0) {
    if (!FPersistentCounts.count(Persistent)) return -1;
    auto It = std::find(FPersistents.begin(), FPersistents.end(), Persistent);
    return static_cast<int>(It - FPersistents.begin());
  }
  for (size_t I = 0; I < FList.size(); ++I)
    if (SameItem(FList[I], Item)) return static_cast<int>(I);
  return -1;
}

IPtr<IItem> TSimpleSelections::GetItems(int Index) {
  if (FList.empty()) return nullptr;
  if (Index < 0 || Index >= GetCount()) throw EListError(SSelectionIndexError, Index);
  return FList[Index];
}

void TSimpleSelections::Insert(const IPtr<IItem>& Item) {
  TPersistent* Persistent = ExtractPersistent(Item);
  FList.push_back(Item);
  FPersistents.push_back(Persistent);
  if (Persistent) ++FPersistentCounts[Persistent];
  else ++FOtherCount;
}

void TSimpleSelections::Forget(std::size_t Index) {
  if (TPersistent* Persistent = FPersistents[Index]) {
    if (--FPersistentCounts[Persistent] == 0) FPersistentCounts.erase(Persistent);
  } else {
    --FOtherCount;
  }
  FList.erase(FList.begin() + static_cast<std::ptrdiff_t>(Index));
  FPersistents.erase(FPersistents.begin() + static_cast<std::ptrdiff_t>(Index));
}

void TSimpleSelections::Add(const IPtr<IItem>& Item) {
  if (IndexOf(Item) >= 0) return;
  Insert(Item);
  Modified();
}

void TSimpleSelections::Remove(const IPtr<IItem>& Item) {
  int Index = IndexOf(Item);
  if (Index >= 0) Remove(Index);
}

void TSimpleSelections::Remove(int Index) {
  if (FList.empty()) return;
  if (Index < 0 || Index >= GetCount()) throw EListError(SSelectionIndexError, Index);
  Forget(static_cast<std::size_t>(Index));
  Modified();
}

void TSimpleSelections::Clear() {
  FList.clear();
  FPersistents.clear();
  FPersistentCounts.clear();
  FOtherCount = 0;
  Modified();
}

void TSimpleSelections::Toggle(const IPtr<IItem>& Item) {
  int Index = IndexOf(Item);
  if (Index >= 0) Remove(Index);
  else Add(Item);
}

void TSimpleSelections::AddListener(const IPtr<ISelectionsListener>& Listener) {
  FListeners->AddListener(Listener);
}

void TSimpleSelections::RemoveListener(const IPtr<ISelectionsListener>& Listener) {
  FListeners->RemoveListener(Listener);
}

void TSimpleSelections::BeginSelections() { ++FBeginCount; }

void TSimpleSelections::EndSelections() {
  if (FBeginCount == 0) throw EInvalidOperation(SUnbalancedEndSelections);
  if (--FBeginCount == 0 && FDirty) Modified();
}

void TSimpleSelections::Modified() {
  if (FBeginCount != 0) {
    FDirty = true;
    return;
  }
  FDirty = false;
  FListeners->SelectionChanged(IPtr<ISelections>(this));
}

} // namespace formkit
