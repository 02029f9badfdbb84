//===- inheritance/UpdateObjects.cpp - What still follows the ancestor -----===//
#include "inheritance/UpdateObjects.h"

#include "inheritance/UpdateFiler.h"
#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit {

namespace {

/// The children of one component in child order on both sides, each as its update
/// object; null for a child that has none.
struct TChildUpdateObjects {
  std::vector<TUpdateObject*> FAncestorList;
  std::vector<TUpdateObject*> FDescendentList;

  TChildUpdateObjects(TUpdateObject* UpdateObject, TPersistent* Ancestor, TPersistent* Descendent) {
    Collect(UpdateObject, dynamic_cast<TComponent*>(Descendent), UpdateObject->ObjectOwner(), FDescendentList);
    Collect(UpdateObject, dynamic_cast<TComponent*>(Ancestor), UpdateObject->AncestorOwner(), FAncestorList);
  }

  static void Collect(TUpdateObject* UpdateObject, TComponent* Parent, TComponent* Root,
                      std::vector<TUpdateObject*>& List) {
    if (!Parent) return;
    Parent->GetChildren([&](TComponent* Child) { List.push_back(UpdateObject->FindChild(Child)); }, Root);
  }
};

bool IsSubComponent(TObject* Value) {
  auto* Component = dynamic_cast<TComponent*>(Value);
  return Component && Component->ComponentStyle().Contains(csSubComponent);
}

bool IsOrdinalKind(TTypeKind Kind) {
  return Kind == tkInteger || Kind == tkChar || Kind == tkEnumeration || Kind == tkSet || Kind == tkWChar;
}

bool IsStringKind(TTypeKind Kind) { return Kind == tkString || Kind == tkLString || Kind == tkUString; }

/// The kinds a filter keeps without comparing: ordinals, floats, strings, sets, classes,
/// methods and wide characters.
bool IsTrackedKind(TTypeKind Kind) { return (Kind >= tkInteger && Kind <= tkWString) || Kind == tkUString; }

/// Kinds an update copies: everything before class references.
constexpr TTypeKind FirstUncopiedKind = tkClassRef;

/// Readable, and writable or holding a sub-component (which is changed in place).
bool IsWritableProp(TObject* Instance, PPropInfo Prop) {
  if (!Prop->IsReadable()) return false;
  if (Prop->IsWritable()) return true;
  return Prop->Kind() == tkClass && IsSubComponent(GetObjectProp(Instance, Prop));
}

/// The position of `Prop` among all properties of `Class`, in class order; -1 when absent.
std::ptrdiff_t ClassPosition(TClass Class, PPropInfo Prop) {
  const std::vector<PPropInfo>& All = Class->Properties();
  auto It = std::find(All.begin(), All.end(), Prop);
  return It == All.end() ? -1 : It - All.begin();
}

} // namespace

//===----------------------------------------------------------------------===//
// Building the tree
//===----------------------------------------------------------------------===//

TUpdateObject::TUpdateObject(TUpdateObject* Owner, TPersistent* Obj, TPersistent* Ancestor, PPropInfo PropInfo,
                             bool Compare, bool IsRoot)
    : FOwner(Owner), FObject(Obj), FAncestor(Ancestor), FPropInfo(PropInfo), FCompare(Compare) {
  if (FOwner) {
    FOwner->FChildList.push_back(this);
    FOwner->FChildIndex.emplace(FObject, this);
    FOwner->FChildIndex.emplace(FAncestor, this);
  }
  auto Undo = OnFailure([this]() noexcept { // the filer goes with its guard
    DropChildren();
    Detach();
  });
  FPropList = FObject->ClassType()->Properties();
  FIsComponent = dynamic_cast<TComponent*>(FObject) && !IsSubComponent(FObject);
  FIsCollection = dynamic_cast<TCollection*>(FObject) != nullptr;
  SetOwners(Owner, IsRoot);
  FUpdateFiler.Reset(new TUpdateFiler(this, FCompare));
  AddSubObjects();
  Filter();
  if (FIsComponent)
    static_cast<TComponent*>(FObject)->GetChildren([this](TComponent* Child) { AddChild(Child); }, FObjectOwner);
  FilterOrder();
  FCompare = true;
}

TUpdateObject::~TUpdateObject() {
  Detach();
  DropChildren();
}

void TUpdateObject::Detach() noexcept {
  if (!FOwner) return;
  auto& Siblings = FOwner->FChildList;
  // Children usually go from the last: look there first.
  if (!Siblings.empty() && Siblings.back() == this) Siblings.pop_back();
  else Siblings.erase(std::remove(Siblings.begin(), Siblings.end(), this), Siblings.end());
  for (const TPersistent* Key : {static_cast<const TPersistent*>(FObject), static_cast<const TPersistent*>(FAncestor)}) {
    auto It = FOwner->FChildIndex.find(Key);
    if (It != FOwner->FChildIndex.end() && It->second == this) FOwner->FChildIndex.erase(It);
  }
  FOwner = nullptr;
}

void TUpdateObject::DropChildren() noexcept {
  // Each child leaves the list as it goes.
  while (!FChildList.empty()) delete FChildList.back();
}

void TUpdateObject::SetOwners(TUpdateObject* Owner, bool IsRoot) {
  if (!FIsComponent) {
    if (Owner) {
      FObjectOwner = Owner->FObjectOwner;
      FAncestorOwner = Owner->FAncestorOwner;
    }
    return;
  }
  auto* Component = static_cast<TComponent*>(FObject);
  FObjectOwner = IsRoot || !Component->Owner() ? Component : Component->Owner();
  auto* AncestorComponent = dynamic_cast<TComponent*>(FAncestor);
  if (AncestorComponent)
    FAncestorOwner = IsRoot || !AncestorComponent->Owner() ? AncestorComponent : AncestorComponent->Owner();
}

void TUpdateObject::AddSubObjects() {
  for (std::size_t I = 0; I < FPropList.size(); ++I) {
    PPropInfo Prop = FPropList[I];
    if (Prop->Kind() != tkClass || !Prop->IsReadable()) continue;
    auto* Value = dynamic_cast<TPersistent*>(GetObjectProp(FObject, Prop));
    if (!Value || (dynamic_cast<TComponent*>(Value) && !IsSubComponent(Value))) continue;
    auto* AncestorValue = FAncestor ? dynamic_cast<TPersistent*>(GetObjectProp(FAncestor, Prop)) : nullptr;
    new TUpdateObject(this, Value, AncestorValue, Prop, FCompare, false);
  }
}

void TUpdateObject::AddChild(TComponent* Child) {
  if (!Child->ComponentState().Contains(csAncestor)) return;
  TComponent* TwinOwner = nullptr;
  if (Child->Owner() == FObjectOwner) TwinOwner = FAncestorOwner;
  else if (Child->Owner() == FObject) TwinOwner = dynamic_cast<TComponent*>(FAncestor);
  if (!TwinOwner) return;
  TComponent* Twin = nullptr;
  if (!Child->Name().empty()) Twin = TwinOwner->FindComponent(Child->Name());
  else if (int Index = Child->ComponentIndex(); Index >= 0 && Index < TwinOwner->ComponentCount())
    Twin = TwinOwner->Components(Index);
  if (Twin) new TUpdateObject(this, Child, Twin, nullptr, FCompare, false);
}

void TUpdateObject::ValidateObjects() {
  if (!FPropInfo || !FOwner) return;
  FObject = dynamic_cast<TPersistent*>(GetObjectProp(FOwner->FObject, FPropInfo));
  FAncestor = FOwner->FAncestor ? dynamic_cast<TPersistent*>(GetObjectProp(FOwner->FAncestor, FPropInfo)) : nullptr;
}

//===----------------------------------------------------------------------===//
// Filtering
//===----------------------------------------------------------------------===//

void TUpdateObject::Filter() {
  ValidateObjects();
  // A sub-object that its owner no longer holds has nothing to compare.
  if (!FObject) return;
  for (std::size_t I = FPropList.size(); I-- > 0;)
    if (!KeepsProperty(FPropList[I])) FPropList.erase(FPropList.begin() + static_cast<std::ptrdiff_t>(I));
  FilterOrder();
  if (FIsCollection && FUpdateCollection && FCompare)
    FUpdateCollection = CollectionsEqual(static_cast<TCollection*>(FObject), dynamic_cast<TCollection*>(FAncestor),
                                         FObjectOwner, FAncestorOwner);
  if (FCompare) FUpdateFiler->Filter();
  for (std::size_t I = 0; I < FChildList.size(); ++I) FChildList[I]->Filter();
}

bool TUpdateObject::KeepsProperty(PPropInfo Prop) {
  if (!IsWritableProp(FObject, Prop)) return false;
  if (!FAncestor || !FCompare || !IsStoredProp(FAncestor, Prop)) return IsTrackedKind(Prop->Kind());
  return EqualsAncestor(Prop);
}

bool TUpdateObject::EqualsAncestor(PPropInfo Prop) {
  TTypeKind Kind = Prop->Kind();
  if (IsOrdinalKind(Kind)) return GetOrdProp(FObject, Prop) == GetOrdProp(FAncestor, Prop);
  if (IsStringKind(Kind)) return GetStrProp(FObject, Prop) == GetStrProp(FAncestor, Prop);
  switch (Kind) {
  case tkFloat: return GetFloatProp(FObject, Prop) == GetFloatProp(FAncestor, Prop);
  case tkWString: return GetWideStrProp(FObject, Prop) == GetWideStrProp(FAncestor, Prop);
  case tkClass:
    return FindChildProp(Prop) || GetObjectProp(FObject, Prop) == static_cast<TObject*>(GetAncestorReference(Prop));
  case tkMethod: return GetMethodProp(FObject, Prop) == GetAncestorMethod(Prop);
  default: return false;
  }
}

void TUpdateObject::FilterOrder() {
  if (!FIsComponent || !FCompare) return;
  TChildUpdateObjects Lists(this, FAncestor, FObject);
  std::size_t A = 0;
  for (TUpdateObject* D : Lists.FDescendentList) {
    if (!D) continue;
    if (A >= Lists.FAncestorList.size()) break;
    if (TUpdateObject* Entry = Lists.FAncestorList[A]; Entry && Entry != D) Entry->FUpdateOrder = false;
    ++A;
  }
}

TComponent* TUpdateObject::GetAncestorPointer(TObject* Value) const {
  auto* Component = dynamic_cast<TComponent*>(Value);
  if (!Component) return nullptr;
  if (Component->Owner() != FAncestorOwner) return Component; // a reference that leaves the family
  return FObjectOwner ? FObjectOwner->FindComponent(Component->Name()) : nullptr;
}

TComponent* TUpdateObject::GetAncestorReference(PPropInfo Prop) const {
  return FAncestor ? GetAncestorPointer(GetObjectProp(FAncestor, Prop)) : nullptr;
}

TMethod TUpdateObject::GetAncestorMethod(PPropInfo Prop) const {
  TMethod Method = GetMethodProp(FAncestor, Prop);
  // Handlers live in the roots' classes, which share code by inheritance.
  if (FAncestorOwner && Method.Data == static_cast<TObject*>(FAncestorOwner))
    Method.Data = static_cast<TObject*>(FObjectOwner);
  return Method;
}

//===----------------------------------------------------------------------===//
// Updating
//===----------------------------------------------------------------------===//

void TUpdateObject::Update(TUpdateRun& Manager) {
  ValidateObjects();
  if (!FObject) return;
  if (FIsComponent) Manager.Updating(static_cast<TComponent*>(FObject));
  for (std::size_t I = 0; I < FPropList.size(); ++I) {
    PPropInfo Prop = FPropList[I];
    if (FAncestor && IsStoredProp(FAncestor, Prop) && Prop->Kind() < FirstUncopiedKind) UpdateProperty(Prop, Manager);
  }
  FUpdateFiler->Update();
  if (FIsComponent) UpdateOrderOfChildren();
  if (FIsCollection && FUpdateCollection && FAncestor) UpdateCollectionItems();
  for (std::size_t I = FChildList.size(); I-- > 0;)
    if (I < FChildList.size() && !FChildList[I]->FPropInfo) FChildList[I]->Update(Manager);
}

void TUpdateObject::UpdateProperty(PPropInfo Prop, TUpdateRun& Manager) {
  TTypeKind Kind = Prop->Kind();
  if (IsOrdinalKind(Kind)) {
    if (std::int64_t V = GetOrdProp(FAncestor, Prop); V != GetOrdProp(FObject, Prop)) SetOrdProp(FObject, Prop, V);
  } else if (IsStringKind(Kind)) {
    if (String V = GetStrProp(FAncestor, Prop); V != GetStrProp(FObject, Prop)) SetStrProp(FObject, Prop, V);
  } else if (Kind == tkFloat) {
    if (double V = GetFloatProp(FAncestor, Prop); V != GetFloatProp(FObject, Prop)) SetFloatProp(FObject, Prop, V);
  } else if (Kind == tkWString) {
    if (WideString V = GetWideStrProp(FAncestor, Prop); V != GetWideStrProp(FObject, Prop))
      SetWideStrProp(FObject, Prop, V);
  } else if (Kind == tkClass) {
    if (TUpdateObject* Child = FindChildProp(Prop)) Child->Update(Manager);
    else if (TComponent* V = GetAncestorReference(Prop); GetObjectProp(FObject, Prop) != static_cast<TObject*>(V))
      SetObjectProp(FObject, Prop, V);
  } else if (Kind == tkMethod && FIsComponent) {
    if (TMethod V = GetAncestorMethod(Prop); V != GetMethodProp(FObject, Prop)) SetMethodProp(FObject, Prop, V);
  }
}

void TUpdateObject::UpdateOrderOfChildren() {
  TChildUpdateObjects Lists(this, FAncestor, FObject);
  // A scratch value: an entry this run does not reach must not move by an older one.
  for (TUpdateObject* Entry : Lists.FAncestorList)
    if (Entry) Entry->FOrder = -1;
  std::size_t A = 0;
  for (std::size_t I = 0; I < Lists.FDescendentList.size(); ++I) {
    TUpdateObject* D = Lists.FDescendentList[I];
    if (!D) continue;
    if (A >= Lists.FAncestorList.size()) break;
    if (TUpdateObject* Entry = Lists.FAncestorList[A]) Entry->FOrder = Entry != D ? static_cast<int>(I) : -1;
    ++A;
  }
  auto* Parent = static_cast<TComponent*>(FObject);
  for (TUpdateObject* Entry : Lists.FAncestorList)
    if (Entry && Entry->FUpdateOrder && Entry->FOrder != -1)
      Parent->SetChildOrder(static_cast<TComponent*>(Entry->FObject), Entry->FOrder);
}

void TUpdateObject::UpdateCollectionItems() {
  auto* Collection = static_cast<TCollection*>(FObject);
  Collection->Assign(FAncestor);
  // Assign brought references to the ancestor's components; they move to their twins.
  for (int I = 0; I < Collection->Count(); ++I) {
    TCollectionItem* Item = Collection->Items(I);
    for (PPropInfo Prop : Item->ClassType()->Properties()) {
      if (Prop->Kind() != tkClass || !Prop->IsReadable() || !Prop->IsWritable()) continue;
      auto* Value = dynamic_cast<TComponent*>(GetObjectProp(Item, Prop));
      if (!Value || !FAncestorOwner || Value->Owner() != FAncestorOwner || !FObjectOwner) continue;
      if (TComponent* Twin = FObjectOwner->FindComponent(Value->Name())) SetObjectProp(Item, Prop, Twin);
    }
  }
}

//===----------------------------------------------------------------------===//
// Reverting, deleting, finding
//===----------------------------------------------------------------------===//

bool TUpdateObject::Revert(TPersistent* Instance, PPropInfo PropInfo) {
  if (Instance != FObject) {
    for (std::size_t I = 0; I < FChildList.size(); ++I)
      if (FChildList[I]->Revert(Instance, PropInfo)) return true;
    return false;
  }
  TClass Class = FObject->ClassType();
  std::ptrdiff_t Position = ClassPosition(Class, PropInfo);
  if (Position >= 0 && std::find(FPropList.begin(), FPropList.end(), PropInfo) == FPropList.end()) {
    auto Place = std::find_if(FPropList.begin(), FPropList.end(),
                              [&](PPropInfo P) { return ClassPosition(Class, P) > Position; });
    FPropList.insert(Place, PropInfo);
  }
  return true;
}

bool TUpdateObject::CanRevert(TPersistent* Instance, PPropInfo PropInfo, bool& Continue) {
  if (Instance != FObject) {
    Continue = true;
    bool Result = false;
    for (std::size_t I = 0; I < FChildList.size() && Continue; ++I)
      Result = FChildList[I]->CanRevert(Instance, PropInfo, Continue);
    return Result;
  }
  Continue = false;
  return PropInfo && FAncestor && PropInfo->IsReadable() && PropInfo->IsWritable() &&
         IsStoredProp(FAncestor, PropInfo);
}

bool TUpdateObject::ComponentDelete(TComponent* Component) {
  if (Component == static_cast<TPersistent*>(FObject)) {
    delete this;
    return true;
  }
  for (std::size_t I = FChildList.size(); I-- > 0;)
    if (I < FChildList.size()) (void)FChildList[I]->ComponentDelete(Component);
  return false;
}

TUpdateObject* TUpdateObject::FindChild(TComponent* Component) {
  auto Is = [Component](const TUpdateObject* U) {
    return U->FObject == static_cast<TPersistent*>(Component) || U->FAncestor == static_cast<TPersistent*>(Component);
  };
  if (Is(this)) return this;
  if (auto Hint = FChildIndex.find(Component); Hint != FChildIndex.end() && Is(Hint->second)) return Hint->second;
  for (TUpdateObject* Child : FChildList)
    if (Is(Child)) return Child;
  for (TUpdateObject* Child : FChildList)
    if (TUpdateObject* Found = Child->FindChild(Component)) return Found;
  return nullptr;
}

TUpdateObject* TUpdateObject::FindChildProp(PPropInfo PropInfo) {
  if (!PropInfo) return nullptr;
  for (TUpdateObject* Child : FChildList)
    if (Child->FPropInfo == PropInfo) return Child;
  return nullptr;
}

bool TUpdateObject::Follows(std::string_view Name) const {
  return std::any_of(FPropList.begin(), FPropList.end(), [&](PPropInfo P) { return SameText(P->Name, Name); });
}

} // namespace formkit
