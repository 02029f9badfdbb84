//===- platform/Classes.cpp - Persistents, components, collections -------===//
#include "platform/Classes.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <unordered_set>

namespace formkit {

FK_RESOURCESTRING(SAssignError, "Cannot assign a %s to a %s");
FK_RESOURCESTRING(SInvalidName, "'%s' is not a valid component name");
FK_RESOURCESTRING(SDuplicateName, "A component named %s already exists");
FK_RESOURCESTRING(SDanglingReference, "Instance of Class %s has dangling reference count of %d");
FK_RESOURCESTRING(SNotAComponentClass, "Class %s is not a component class");

//===----------------------------------------------------------------------===//
// TPersistent
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPersistent, "Classes") {}

void TPersistent::Assign(TPersistent* Source) {
  if (Source) Source->AssignTo(this);
  else AssignError(nullptr);
}

void TPersistent::AssignTo(TPersistent* Dest) { Dest->AssignError(this); }

void TPersistent::AssignError(TPersistent* Source) {
  throw EConvertError(SAssignError, Source ? Source->ClassName() : String("nil"), ClassName());
}

String TPersistent::GetNamePath() { return ClassName(); }

void TPersistent::BeforeDestruction() {
  if (FPendingReferences) detail::ForgetPendingReferences(this);
  inherited::BeforeDestruction();
}

void TPersistent::DefineProperties(TFiler*) {}

//===----------------------------------------------------------------------===//
// TComponent
//===----------------------------------------------------------------------===//

namespace {
void ReportDanglingReference(const String& ClassName, int Count) {
  std::fprintf(stderr, "%s\n", Format(LoadResString(SDanglingReference), ClassName, Count).c_str());
}
using TDanglingHook = void (*)(const String&, int);
} // namespace

std::function<void(const String&, int)> DanglingComponentReferenceHook = ReportDanglingReference;

namespace {
[[maybe_unused]] bool DanglingComponentReferenceHookReplaced() {
  const TDanglingHook* Target = DanglingComponentReferenceHook.target<TDanglingHook>();
  return !Target || *Target != &ReportDanglingReference;
}
} // namespace

FK_IMPLEMENT(TComponent, "Classes") {
  B.Property("Name", &TComponent::Name, &TComponent::SetName).Type(&TypeInfo_TComponentName).Stored(false);
  B.Property("Tag", &TComponent::Tag, &TComponent::SetTag).Default(0);
}

void TComponent::Create(TComponent* AOwner) {
  if (AOwner) AOwner->InsertComponent(this);
}

TComponent* TComponent::Components(int Index) const {
  if (Index < 0 || Index >= ComponentCount()) throw EListError(SListIndexError, Index);
  return FComponents[static_cast<size_t>(Index)];
}

int TComponent::ComponentIndex() const {
  if (!FOwner) return -1;
  const auto& List = FOwner->FComponents;
  // Searching from the back makes the common teardown order O(1).
  for (size_t I = List.size(); I-- > 0;)
    if (List[I] == this) return static_cast<int>(I);
  return -1;
}

void TComponent::SetComponentIndex(int Index) {
  if (!FOwner) return;
  auto& List = FOwner->FComponents;
  int Current = ComponentIndex();
  if (Current < 0) return;
  Index = std::clamp(Index, 0, static_cast<int>(List.size()) - 1);
  if (Index == Current) return;
  List.erase(List.begin() + Current);
  List.insert(List.begin() + Index, this);
}

TComponent* TComponent::FindComponent(std::string_view Name) const {
  return Name.empty() ? nullptr : FNameIndex.Find(Name);
}

void TComponent::IndexName(TComponent* Component) {
  if (!Component->FName.empty()) FNameIndex.Insert(Component);
}

void TComponent::UnindexName(TComponent* Component) {
  if (!Component->FName.empty()) FNameIndex.Erase(Component);
}

//===----------------------------------------------------------------------===//
// Interface references to components
//===----------------------------------------------------------------------===//

namespace detail {
/// The counted stand-in of one component. The component knows its wrapper (to cut the
/// link when it goes); the wrapper knows its component until then.
class TComponentReference : public TInterfacedObject, public IComponentReferenceSource {
  FK_CLASS(TComponentReference, TInterfacedObject)
  FK_INTERFACES(IComponentReferenceSource)

  explicit TComponentReference(TComponent* Component) : FComponent(Component) {}
  TComponent* GetComponent() override { return FComponent; }
  /// Called by the component's teardown.
  void ComponentGone() noexcept { FComponent = nullptr; }
  void BeforeDestruction() override {
    if (FComponent) FComponent->FReference = nullptr;
    inherited::BeforeDestruction();
  }

private:
  TComponent* FComponent; // plain back reference, cleared by the component's teardown
};
FK_IMPLEMENT(TComponentReference, "Classes") {}
} // namespace detail

IPtr<IComponentReferenceSource> ComponentReference(TComponent* Component) {
  if (!Component) return nullptr;
  if (Component->FReference) return IPtr<IComponentReferenceSource>(Component->FReference);
  IPtr<detail::TComponentReference> Ref = New<detail::TComponentReference>(Component);
  Component->FReference = Ref.Get();
  return Ref;
}

TComponent* ReferencedComponent(const IPtr<IInterface>& Reference) {
  IPtr<IComponentReferenceSource> Ref = QueryAs<IComponentReferenceSource>(Reference);
  return Ref ? Ref->GetComponent() : nullptr;
}

//===----------------------------------------------------------------------===//
// Links of free notification
//===----------------------------------------------------------------------===//

namespace detail {
void TComponentLinks::Add(TComponent* C) {
  if (Contains(C)) return;
  FItems.push_back(C);
  if (FIndex) FIndex->emplace(C, FItems.size() - 1);
  else if (FItems.size() > IndexFrom) BuildIndex();
}

bool TComponentLinks::Contains(TComponent* C) const noexcept {
  if (FIndex) return FIndex->count(C) != 0;
  return std::find(FItems.begin(), FItems.end(), C) != FItems.end();
}

bool TComponentLinks::Remove(TComponent* C) noexcept {
  size_t At;
  if (FIndex) {
    auto It = FIndex->find(C);
    if (It == FIndex->end()) return false;
    At = It->second;
    FIndex->erase(It);
  } else {
    auto It = std::find(FItems.begin(), FItems.end(), C);
    if (It == FItems.end()) return false;
    At = static_cast<size_t>(It - FItems.begin());
  }
  if (At + 1 != FItems.size()) {
    FItems[At] = FItems.back();
    if (FIndex) (*FIndex)[FItems[At]] = At;
  }
  FItems.pop_back();
  if (FItems.empty()) FIndex.reset();
  return true;
}

TComponent* TComponentLinks::PopBack() noexcept {
  TComponent* C = FItems.back();
  FItems.pop_back();
  if (FIndex) FIndex->erase(C);
  if (FItems.empty()) FIndex.reset();
  return C;
}

void TComponentLinks::BuildIndex() {
  FIndex = std::make_unique<std::unordered_map<TComponent*, size_t>>();
  FIndex->reserve(FItems.size() * 2);
  for (size_t I = 0; I < FItems.size(); ++I) FIndex->emplace(FItems[I], I);
}
} // namespace detail

//===----------------------------------------------------------------------===//
// The name index
//===----------------------------------------------------------------------===//

namespace detail {
namespace {
TComponent* const Tombstone = reinterpret_cast<TComponent*>(std::uintptr_t(1));

std::uint64_t NameHash(std::string_view Name) noexcept {
  return FoldedNameHash(Name) | 1; // never 0, so a zero hash marks nothing
}
} // namespace

TComponent* TNameIndex::Find(std::string_view Name) const noexcept {
  if (FCount == 0) return nullptr;
  std::uint64_t H = NameHash(Name);
  size_t Mask = FSlots.size() - 1;
  for (size_t I = H & Mask;; I = (I + 1) & Mask) {
    const Slot& S = FSlots[I];
    if (!S.Component) return nullptr;
    if (S.Hash == H && S.Component != Tombstone && SameText(S.Component->Name(), Name)) return S.Component;
  }
}

void TNameIndex::Insert(TComponent* Component) {
  // At most half full: a lookup that misses (every new name) then probes about two slots.
  if ((FUsed + 1) * 2 > FSlots.size()) Grow();
  std::uint64_t H = NameHash(Component->Name());
  size_t Mask = FSlots.size() - 1;
  size_t I = H & Mask;
  while (FSlots[I].Component && FSlots[I].Component != Tombstone) I = (I + 1) & Mask;
  if (!FSlots[I].Component) ++FUsed;
  FSlots[I] = {H, Component};
  ++FCount;
}

void TNameIndex::Erase(TComponent* Component) noexcept {
  if (FCount == 0) return;
  std::uint64_t H = NameHash(Component->Name());
  size_t Mask = FSlots.size() - 1;
  for (size_t I = H & Mask; FSlots[I].Component; I = (I + 1) & Mask)
    if (FSlots[I].Component == Component) {
      FSlots[I].Component = Tombstone;
      if (--FCount == 0) Clear();
      return;
    }
}

void TNameIndex::Clear() noexcept {
  FSlots.clear();
  FCount = FUsed = 0;
}

void TNameIndex::Grow() {
  std::vector<Slot> Old;
  Old.swap(FSlots);
  // Tombstones are dropped; double only when live entries need it.
  size_t Size = 16;
  while ((FCount + 1) * 4 > Size) Size *= 2;
  FSlots.assign(Size, Slot{});
  FUsed = FCount;
  size_t Mask = Size - 1;
  for (const Slot& S : Old) {
    if (!S.Component || S.Component == Tombstone) continue;
    size_t I = S.Hash & Mask;
    while (FSlots[I].Component) I = (I + 1) & Mask;
    FSlots[I] = S;
  }
}
} // namespace detail

void TComponent::InsertComponent(TComponent* Component) {
  ValidateRename(Component, "", Component->FName);
  Insert(Component);
  if (FComponentState.Contains(csDesigning)) Component->SetDesigning(true);
  SendNotification(Component, opInsert);
}

void TComponent::RemoveComponent(TComponent* Component) {
  SendNotification(Component, opRemove);
  Remove(Component);
}

void TComponent::Insert(TComponent* Component) {
  FComponents.push_back(Component);
  Component->FOwner = this;
  IndexName(Component);
}

void TComponent::Remove(TComponent* Component) {
  UnindexName(Component);
  for (size_t I = FComponents.size(); I-- > 0;)
    if (FComponents[I] == Component) {
      FComponents.erase(FComponents.begin() + static_cast<std::ptrdiff_t>(I));
      break;
    }
  Component->FOwner = nullptr;
}

void TComponent::DestroyComponents() {
  // While the owner goes, its components need not hear of each other's removal: what
  // holds a reference across owners is linked by FreeNotification and told directly.
  // The name index goes at once rather than name by name.
  FNameIndex.Clear();
  while (!FComponents.empty()) {
    TComponent* Last = FComponents.back();
    Remove(Last);
    Last->Destroy();
  }
}

void TComponent::SetName(const String& NewName) {
  if (FName == NewName) return;
  if (!NewName.empty() && !IsValidIdent(NewName)) throw EComponentError(SInvalidName, NewName);
  // An owner may not take the name of one of its components: references would not know
  // which is meant.
  if (!NewName.empty() && !SameText(FName, NewName) && FindComponent(NewName))
    throw EComponentError(SDuplicateName, NewName);
  if (FOwner) FOwner->ValidateRename(this, FName, NewName);
  else ValidateRename(nullptr, FName, NewName);
  ChangeName(NewName);
}

void TComponent::ChangeName(const String& NewName) {
  if (FOwner) FOwner->UnindexName(this);
  FName = NewName;
  if (FOwner) FOwner->IndexName(this);
}

void TComponent::ValidateRename(TComponent* Component, const String& CurName, const String& NewName) {
  if (Component && !NewName.empty() && !SameText(CurName, NewName)) {
    TComponent* Existing = FindComponent(NewName);
    if (Existing && Existing != Component) throw EComponentError(SDuplicateName, NewName);
    // A reference by that name would mean the owner: the name is taken.
    if (SameText(NewName, FName)) throw EComponentError(SDuplicateName, NewName);
  }
  if (IsDesigning())
    if (IPtr<IDesignerNotify> Designer = FindRootDesigner(this)) Designer->ValidateRename(Component, CurName, NewName);
}

void TComponent::Notification(TComponent* AComponent, TOperation Operation) {
  if (Operation != opRemove || !AComponent) return;
  ForgetFreeNotification(AComponent);
  // Owned components hear of a removal, so that references between siblings can be
  // cleared. Insertions are told to the owner alone: telling every sibling would make
  // filling an owner quadratic. While the owner goes, or its components leave together,
  // they all go: none needs to hear of another.
  if (FQuietRemovals || FComponentState.Contains(csDestroying)) return;
  for (size_t I = FComponents.size(); I-- > 0;) {
    if (I >= FComponents.size()) continue; // a handler may have removed components
    FComponents[I]->SendNotification(AComponent, Operation);
  }
}

void TComponent::SendNotification(TComponent* AComponent, TOperation Operation) {
  for (TClass C = ClassType(); C && C->Generated; C = C->Parent)
    if (C->OnNotification) {
      C->OnNotification(this, AComponent, Operation);
      break;
    }
  Notification(AComponent, Operation);
}

void TComponent::FreeNotification(TComponent* AComponent) {
  if (!AComponent || AComponent == this) return;
  FFreeNotifies.Add(AComponent);
  AComponent->FFreeNotifies.Add(this);
  FComponentState.Include(csFreeNotification);
  AComponent->FComponentState.Include(csFreeNotification);
}

void TComponent::RemoveFreeNotification(TComponent* AComponent) {
  if (!AComponent) return;
  ForgetFreeNotification(AComponent);
  AComponent->ForgetFreeNotification(this);
}

void TComponent::ForgetFreeNotification(TComponent* Component) {
  FFreeNotifies.Remove(Component);
  if (FFreeNotifies.Empty()) FComponentState.Exclude(csFreeNotification);
}

void TComponent::Loaded() { FComponentState.Exclude(csLoading); }

void TComponent::Updating() { FComponentState.Include(csUpdating); }

void TComponent::Updated() { FComponentState.Exclude(csUpdating); }

void TComponent::GetChildren(const TGetChildProc&, TComponent*) {}

void TComponent::SetChildOrder(TComponent*, int) {}

void TComponent::SetParentComponent(TComponent*) {}

void TComponent::SetComponentStateFlag(TComponentStateFlag Flag, bool Value) noexcept {
  if (Value) FComponentState.Include(Flag);
  else FComponentState.Exclude(Flag);
}

void TComponent::SetDesigning(bool Value, bool SetChildren) {
  SetComponentStateFlag(csDesigning, Value);
  if (SetChildren)
    for (TComponent* C : FComponents) C->SetDesigning(Value, true);
}

void TComponent::SetDesignInstance(bool Value) { SetComponentStateFlag(csDesignInstance, Value); }
void TComponent::SetAncestor(bool Value) {
  SetComponentStateFlag(csAncestor, Value);
  for (TComponent* C : FComponents) C->SetAncestor(Value);
}
void TComponent::SetInline(bool Value) { SetComponentStateFlag(csInline, Value); }
void TComponent::SetLoading(bool Value) { SetComponentStateFlag(csLoading, Value); }
void TComponent::SetReading(bool Value) { SetComponentStateFlag(csReading, Value); }
void TComponent::SetWriting(bool Value) { SetComponentStateFlag(csWriting, Value); }

IPtr<IDesignerNotify> TComponent::GetDesigner() { return nullptr; }

String TComponent::GetNamePath() { return FName; }

void TComponent::Destroying() {
  if (FComponentState.Contains(csDestroying)) return;
  FComponentState.Include(csDestroying);
  for (TComponent* C : FComponents) C->Destroying();
}

void TComponent::BeforeDestruction() {
  // Tell everyone linked across owners, then free the owned components.
  while (!FFreeNotifies.Empty()) {
    TComponent* Other = FFreeNotifies.PopBack();
    Other->ForgetFreeNotification(this);
    Other->SendNotification(this, opRemove);
  }
  FComponentState.Exclude(csFreeNotification);
  DestroyComponents();
  if (FOwner) FOwner->RemoveComponent(this);
  if (FReference) std::exchange(FReference, nullptr)->ComponentGone();
  inherited::BeforeDestruction();
}

void TComponent::FreeInstance() {
  if (FRefTally <= 0) {
    inherited::FreeInstance();
    return;
  }
  // A plain interface reference outlived the component: a programming error. Say so, and
  // keep the memory until that reference goes, so its release does not corrupt anything.
  if (DanglingComponentReferenceHook) DanglingComponentReferenceHook(ClassName(), FRefTally);
  FAwaitingRelease = true;
#ifdef FK_ABORT_ON_DANGLING_REFERENCE
  if (!DanglingComponentReferenceHookReplaced()) std::abort();
#endif
}

int TComponent::ObjRelease() {
  int Count = --FRefTally;
  if (Count == 0 && FAwaitingRelease) delete this;
  return Count;
}

void FreeComponentsTogether(const std::vector<TComponent*>& Components) {
  std::unordered_set<TComponent*> Going(Components.begin(), Components.end());
  for (TComponent* C : Components) C->Destroying();
  // Owners that stay are quiet while their components leave; an owner that goes too is
  // quiet already (it is destroying).
  std::vector<TComponent*> Owners;
  for (TComponent* C : Components)
    if (TComponent* Owner = C->FOwner; Owner && !Going.count(Owner) && !Owner->FQuietRemovals) {
      Owner->FQuietRemovals = true;
      Owners.push_back(Owner);
    }
  // The owners' flags are cleared on the way out, also when a teardown throws.
  auto Restore = Finally([&]() noexcept {
    for (TComponent* Owner : Owners) Owner->FQuietRemovals = false;
  });
  for (TComponent* C : Components) C->Destroy();
}

TComponent* CreateComponent(TClass Class, TComponent* Owner) {
  if (!Class->InheritsFrom(TComponent::StaticClass())) throw EComponentError(SNotAComponentClass, Class->ClassName);
  auto* Instance = static_cast<TComponent*>(Class->NewInstance());
  RunConstructor(Instance, Owner);
  return Instance;
}

void RunConstructor(TComponent* Instance, TComponent* Owner) {
  auto Free = OnFailure([Instance]() noexcept { Instance->Destroy(); });
  Instance->Create(Owner);
  Instance->AfterConstruction();
}

//===----------------------------------------------------------------------===//
// Collections
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCollectionItem, "Classes") {}
FK_IMPLEMENT(TCollection, "Classes") {}
FK_IMPLEMENT(TOwnedCollection, "Classes") {}

void TCollectionItem::Create(TCollection* ACollection) { SetCollection(ACollection); }

void TCollectionItem::SetCollection(TCollection* Value) {
  if (FCollection == Value) return;
  if (FCollection) FCollection->RemoveItem(this);
  if (Value) Value->InsertItem(this);
}

int TCollectionItem::Index() const {
  if (!FCollection) return -1;
  const auto& Items = FCollection->FItems;
  auto It = std::find(Items.begin(), Items.end(), this);
  return It == Items.end() ? -1 : static_cast<int>(It - Items.begin());
}

void TCollectionItem::SetIndex(int Value) {
  int Current = Index();
  if (Current < 0 || Value == Current) return;
  auto& Items = FCollection->FItems;
  if (Value < 0 || Value >= static_cast<int>(Items.size())) throw EListError(SListIndexError, Value);
  Items.erase(Items.begin() + Current);
  Items.insert(Items.begin() + Value, this);
  Changed(true);
}

String TCollectionItem::GetDisplayName() { return ClassName(); }

String TCollectionItem::GetNamePath() {
  if (!FCollection) return ClassName();
  return Format("%s[%d]", FCollection->GetNamePath(), Index());
}

TPersistent* TCollectionItem::GetOwner() { return FCollection; }

void TCollectionItem::Changed(bool AllItems) {
  if (FCollection && FCollection->UpdateCount() == 0) FCollection->Update(AllItems ? nullptr : this);
}

void TCollectionItem::BeforeDestruction() {
  SetCollection(nullptr);
  inherited::BeforeDestruction();
}

TCollectionItem* TCollection::Items(int Index) const {
  if (Index < 0 || Index >= Count()) throw EListError(SListIndexError, Index);
  return FItems[static_cast<size_t>(Index)];
}

TCollectionItem* TCollection::Add() {
  TClass Class = FItemClass ? FItemClass : TCollectionItem::StaticClass();
  auto* Item = static_cast<TCollectionItem*>(Class->NewInstance());
  auto Free = OnFailure([Item]() noexcept { Item->Destroy(); });
  Item->Create(this);
  Item->AfterConstruction();
  return Item;
}

TCollectionItem* TCollection::Insert(int Index) {
  if (Index < 0 || Index > Count()) throw EListError(SListIndexError, Index);
  TCollectionItem* Item = Add();
  Item->SetIndex(Index);
  return Item;
}

void TCollection::Delete(int Index) { Items(Index)->Destroy(); }

void TCollection::Clear() {
  if (FItems.empty()) return;
  BeginUpdate();
  while (!FItems.empty()) FItems.back()->Destroy();
  EndUpdate();
}

TCollectionItem* TCollection::FindItemID(int ID) const {
  for (TCollectionItem* Item : FItems)
    if (Item->FID == ID) return Item;
  return nullptr;
}

String TCollection::GetItemAttr(int Index, int ItemIndex) {
  return Index == 0 ? Items(ItemIndex)->GetDisplayName() : String();
}

void TCollection::EndUpdate() {
  if (FUpdateCount > 0 && --FUpdateCount == 0) Changed();
}

void TCollection::Assign(TPersistent* Source) {
  auto* Other = dynamic_cast<TCollection*>(Source);
  if (!Other) {
    inherited::Assign(Source);
    return;
  }
  BeginUpdate();
  // Ending the update tells the collection's owner, which may fail: after a failure here
  // that one passes on; after success, its own does.
  auto End = OnFailure([this]() noexcept { RunIgnoringExceptions([this] { EndUpdate(); }); });
  Clear();
  for (TCollectionItem* Item : Other->FItems) Add()->Assign(Item);
  End.Dismiss();
  EndUpdate();
}

String TCollection::GetNamePath() {
  TPersistent* Owner = GetOwner();
  if (!Owner) return ClassName();
  String Path = Owner->GetNamePath();
  if (Path.empty()) return ClassName();
  for (PPropInfo P : Owner->ClassType()->Properties())
    if (P->Kind() == tkClass && GetObjectProp(Owner, P) == this) return Path + "." + P->Name;
  return Path + "." + ClassName();
}

void TCollection::Update(TCollectionItem*) {}

void TCollection::Changed() {
  if (FUpdateCount == 0) Update(nullptr);
}

void TCollection::InsertItem(TCollectionItem* Item) {
  FItems.push_back(Item);
  Item->FCollection = this;
  Item->FID = FNextID++;
  Changed();
}

void TCollection::RemoveItem(TCollectionItem* Item) {
  for (size_t I = FItems.size(); I-- > 0;)
    if (FItems[I] == Item) {
      FItems.erase(FItems.begin() + static_cast<std::ptrdiff_t>(I));
      break;
    }
  Item->FCollection = nullptr;
  Changed();
}

void TCollection::BeforeDestruction() {
  FUpdateCount = 1; // no change notifications while the items go
  while (!FItems.empty()) FItems.back()->Destroy();
  inherited::BeforeDestruction();
}

} // namespace formkit
