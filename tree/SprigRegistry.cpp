//===- tree/SprigRegistry.cpp - Which sprig class shows which object -----===//
//
// The two registries, their scoring and one-answer memory, the defaults the
// core registers, and the release of a package group's registrations.
//
//===----------------------------------------------------------------------===//
#include "tree/SprigRegistry.h"
#include "tree/RootSprig.h"

#include "core/EditorGroups.h"

#include <climits>

namespace formkit {

FK_IMPLEMENT(TSprigTypeList, "TreeIntf") {}

namespace {
TObjectGuard<TSprigTypeList> GSprigRegistry;
TObjectGuard<TSprigTypeList> GRootSprigRegistry;

TSprigTypeList* Ensure(TObjectGuard<TSprigTypeList>& Registry) {
  if (!Registry) Registry.Reset(new TSprigTypeList());
  return Registry.Get();
}

/// Whether instances of `AClass` answer to `IID`. Classes declare their interfaces in
/// code, so an instance allocated without its constructor answers as a made one would.
bool ClassImplements(TClass AClass, const TGUID& IID) {
  if (!AClass->Factory) return false; // abstract: nothing to ask
  TObjectGuard<TObject> Probe(AClass->NewInstance());
  return Probe->GetInterfaceEntry(IID) != nullptr;
}

TSprigClass FindBest(TSprigTypeList* Registry, TClass AClass, TSprigClass AMinimum) {
  if (!Registry || !AClass) return nullptr;
  TSprigClass Found = Registry->Match(AClass);
  if (Found && AMinimum && !Found->InheritsFrom(AMinimum)) return nullptr;
  return Found;
}

/// Drops what an unloaded package registered in either registry.
void DropGroup(int Group) {
  if (GSprigRegistry) GSprigRegistry->FreeEditorGroup(Group);
  if (GRootSprigRegistry) GRootSprigRegistry->FreeEditorGroup(Group);
}
} // namespace

//===----------------------------------------------------------------------===//
// Registrations
//===----------------------------------------------------------------------===//

int TSprigType::Score(TClass AClass) const noexcept {
  int Generations = 0;
  for (TClass C = AClass; C; C = C->Parent, ++Generations)
    if (C == Class) return Generations;
  return INT_MAX;
}

bool TSprigIntfType::Match(TClass AClass) const {
  for (const TGUID& IID : Interfaces)
    if (!ClassImplements(AClass, IID)) return false;
  return true;
}

void TSprigTypeList::Add(TClass AClass, TSprigClass ASprigClass) {
  FList.insert(FList.begin(), TSprigType{CurrentGroup, AClass, ASprigClass});
}

void TSprigTypeList::Add(const TGUIDArray& AInterfaces, TSprigClass ASprigClass) {
  FInterfaceList.insert(FInterfaceList.begin(), TSprigIntfType{CurrentGroup, AInterfaces, ASprigClass});
}

void TSprigTypeList::ClearCache() noexcept {
  FLastClass = nullptr;
  FLastSprigClass = nullptr;
}

TSprigClass TSprigTypeList::Match(TClass AClass) {
  if (TSprigClass Cached = MatchCache(AClass)) return Cached;
  return MatchClass(AClass);
}

TSprigClass TSprigTypeList::MatchCache(TClass AClass) const noexcept {
  return AClass && AClass == FLastClass ? FLastSprigClass : nullptr;
}

TSprigClass TSprigTypeList::MatchClass(TClass AClass) {
  TSprigClass Found = nullptr;
  for (const TSprigIntfType& Entry : FInterfaceList)
    if (Entry.Match(AClass)) {
      Found = Entry.SprigClass;
      break;
    }
  if (!Found) {
    int Best = INT_MAX;
    for (const TSprigType& Entry : FList) // newest first: on a tie the newer stays
      if (int Score = Entry.Score(AClass); Score < Best) {
        Best = Score;
        Found = Entry.SprigClass;
      }
  }
  if (Found) {
    FLastClass = AClass;
    FLastSprigClass = Found;
  }
  return Found;
}

void TSprigTypeList::FreeEditorGroup(int AGroup) {
  ClearCache();
  std::erase_if(FList, [&](const TSprigType& E) { return E.Group == AGroup; });
  std::erase_if(FInterfaceList, [&](const TSprigIntfType& E) { return E.Group == AGroup; });
}

//===----------------------------------------------------------------------===//
// The entries
//===----------------------------------------------------------------------===//

void RegisterSprigType(TClass AClass, TSprigClass ASprigClass) { Ensure(GSprigRegistry)->Add(AClass, ASprigClass); }
void RegisterSprigType(const TGUIDArray& AInterfaces, TSprigClass ASprigClass) {
  Ensure(GSprigRegistry)->Add(AInterfaces, ASprigClass);
}
TSprigClass FindBestSprigClass(TClass AClass) { return FindBestSprigClass(AClass, TSprig::StaticClass()); }
TSprigClass FindBestSprigClass(TClass AClass, TSprigClass AMinimumSprigClass) {
  return FindBest(GSprigRegistry.Get(), AClass, AMinimumSprigClass);
}

void RegisterRootSprigType(TClass AClass, TSprigClass ASprigClass) {
  Ensure(GRootSprigRegistry)->Add(AClass, ASprigClass);
}
void RegisterRootSprigType(const TGUIDArray& AInterfaces, TSprigClass ASprigClass) {
  Ensure(GRootSprigRegistry)->Add(AInterfaces, ASprigClass);
}
TRootSprigClass FindBestRootSprigClass(TClass AClass) {
  return FindBestRootSprigClass(AClass, TRootSprig::StaticClass());
}
TRootSprigClass FindBestRootSprigClass(TClass AClass, TSprigClass AMinimumSprigClass) {
  return FindBest(GRootSprigRegistry.Get(), AClass, AMinimumSprigClass);
}

TSprigTypeList* SprigRegistry() noexcept { return GSprigRegistry.Get(); }
TSprigTypeList* RootSprigRegistry() noexcept { return GRootSprigRegistry.Get(); }

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

namespace detail {

void StartSprigRegistries() { NotifyGroupChange(&DropGroup); }

void StopSprigRegistries() noexcept {
  UnnotifyGroupChange(&DropGroup);
  GSprigRegistry.Reset();
  GRootSprigRegistry.Reset();
}

void RegisterDefaultSprigs() {
  RegisterSprigType(TPersistent::StaticClass(), TPersistentSprig::StaticClass());
  RegisterSprigType(TCollection::StaticClass(), TCollectionSprig::StaticClass());
  RegisterSprigType(TCollectionItem::StaticClass(), TCollectionItemSprig::StaticClass());
  RegisterSprigType(TComponent::StaticClass(), TComponentSprig::StaticClass());
  RegisterRootSprigType(TPersistent::StaticClass(), TRootSprig::StaticClass());
}

} // namespace detail
} // namespace formkit
