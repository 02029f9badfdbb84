//===- tree/CollectionSprigs.cpp - Collections and their items as sprigs -===//
//
// A component's published collections show as nodes beneath it, and their
// items beneath those, in the collection's own order.
//
//===----------------------------------------------------------------------===//
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

#include "platform/TypInfo.h"

#include <unordered_map>
#include <unordered_set>

namespace formkit {

FK_IMPLEMENT(TPropertySprig, "TreeIntf") {}
FK_IMPLEMENT(TCollectionSprig, "TreeIntf") {}
FK_IMPLEMENT(TCollectionItemSprig, "TreeIntf") {}

namespace {
FK_RESOURCESTRING(SAddItem, "Add item");

/// The top of the chain of owners of `P`; null when `P` has no owner.
TPersistent* UltimateOwnerOf(TPersistent* P) {
  TPersistent* Top = nullptr;
  for (TPersistent* O = P->GetOwner(); O; O = O->GetOwner()) Top = O;
  return Top;
}
} // namespace

//===----------------------------------------------------------------------===//
// Finding the collections of an item
//===----------------------------------------------------------------------===//

namespace {
/// Whether a property of this declared class can hold a collection: the two classes are
/// related. Reading the others (fonts, controls) could only find none.
bool MayHoldCollection(PPropInfo Prop) {
  TClass Declared = GetObjectPropClass(Prop);
  TClass Collection = TCollection::StaticClass();
  return Declared && (Declared->InheritsFrom(Collection) || Collection->InheritsFrom(Declared));
}
} // namespace

namespace {
/// The properties of each class that may hold a collection, found at the class's first
/// sprig; exists while the tree runs.
std::unique_ptr<std::unordered_map<TClass, std::vector<PPropInfo>>> GCollectionProperties;

/// The published properties of `Class` that may hold a collection, in sorted order.
/// Generated classes share their compiled class's properties, so that is the key.
const std::vector<PPropInfo>& CollectionPropertiesOf(TClass Class) {
  if (!GCollectionProperties) GCollectionProperties = std::make_unique<std::unordered_map<TClass, std::vector<PPropInfo>>>();
  auto [It, Added] = GCollectionProperties->try_emplace(Class);
  if (Added)
    for (PPropInfo Prop : Class->SortedProperties())
      if (Prop->Kind() == tkClass && MayHoldCollection(Prop)) It->second.push_back(Prop);
  return It->second;
}
} // namespace

namespace detail {
void FreeCollectionProperties() noexcept { GCollectionProperties.reset(); }
} // namespace detail

void TSprig::FigureCollections() {
  for (PPropInfo Prop : CollectionPropertiesOf(FItem->CompiledClass())) {
    auto* Collection = dynamic_cast<TCollection*>(GetObjectProp(FItem, Prop));
    if (!Collection || !UltimateOwnerOf(Collection) || Find(Collection, false)) continue;
    TSprigClass SprigClass = FindBestSprigClass(Collection->ClassType(), TCollectionSprig::StaticClass());
    if (!SprigClass) continue;
    TObjectGuard<TSprig> Sprig = NewSprig(SprigClass, Collection);
    auto* CollectionSprig = static_cast<TCollectionSprig*>(Sprig.Get());
    CollectionSprig->SetPropName(Prop->Name);
    CollectionSprig->SetOwner(this);
    Add(Sprig.Release());
  }
}

//===----------------------------------------------------------------------===//
// TCollectionSprig
//===----------------------------------------------------------------------===//

void TCollectionSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageCollection);
}

bool TCollectionSprig::CustomDelete() {
  auto* Collection = static_cast<TCollection*>(Item());
  if (!Collection || Collection->Count() == 0) return false;
  for (int I = Count() - 1; I >= 0; --I) Items(I)->Invalidate(); // their items go now
  Collection->Clear();
  return true;
}

void TCollectionSprig::DropGoneItems() {
  auto* Collection = static_cast<TCollection*>(Item());
  std::unordered_set<const TPersistent*> Present;
  for (int I = 0; Collection && I < Collection->Count(); ++I) Present.insert(Collection->Items(I));
  for (int I = Count() - 1; I >= 0; --I) {
    TSprig* Child = Items(I);
    if (dynamic_cast<TCollectionItemSprig*>(Child) && !Child->Invalid() && !Present.contains(Child->Item()))
      Child->Invalidate(); // the next repopulation frees it
  }
}

void TCollectionSprig::SortItems() {
  DropGoneItems();
  inherited::SortItems();
}

String TCollectionSprig::Name() { return Format("<Collection.%s>", FPropName); }

void TCollectionSprig::FigureParent() {
  if (!FOwner) return;
  if (TSprig* Parent = SeekParent(FOwner->Item(), true)) Parent->Add(this);
}

void TCollectionSprig::FigureChildren() {
  inherited::FigureChildren();
  auto* Collection = static_cast<TCollection*>(Item());
  if (!Collection) return;
  for (int I = 0; I < Collection->Count(); ++I) {
    TCollectionItem* CollectionItem = Collection->Items(I);
    if (Find(CollectionItem, false)) continue;
    TSprigClass SprigClass =
        FindBestSprigClass(CollectionItem->ClassType(), TCollectionItemSprig::StaticClass());
    if (!SprigClass) continue;
    TObjectGuard<TSprig> Sprig = NewSprig(SprigClass, CollectionItem);
    static_cast<TCollectionItemSprig*>(Sprig.Get())->SetOwner(this);
    Add(Sprig.Release());
  }
}

String TCollectionSprig::GetAddType(int) { return LoadResString(SAddItem); }

void TCollectionSprig::AddType(int) {
  auto* Collection = static_cast<TCollection*>(Item());
  if (!Collection) return;
  TCollectionItem* NewItem = Collection->Add();
  SelectItems({NewItem}, true);
}

//===----------------------------------------------------------------------===//
// TCollectionItemSprig
//===----------------------------------------------------------------------===//

void TCollectionItemSprig::FigureParent() {
  if (!FOwner) return;
  if (TSprig* Parent = SeekParent(FOwner->Item(), true)) Parent->Add(this);
}

String TCollectionItemSprig::Name() {
  auto* CollectionItem = static_cast<TCollectionItem*>(Item());
  return CollectionItem ? CollectionItem->GetDisplayName() : String();
}

int TCollectionItemSprig::ItemIndex() {
  auto* CollectionItem = static_cast<TCollectionItem*>(Item());
  return CollectionItem ? CollectionItem->Index() : 0;
}

bool TCollectionItemSprig::DragOverTo(TSprig* AParent) { return AParent && AParent->Parent() == Parent(); }

bool TCollectionItemSprig::DragDropTo(TSprig* AParent) {
  auto* CollectionItem = static_cast<TCollectionItem*>(Item());
  if (!CollectionItem || !AParent || AParent->Parent() != Parent()) return false;
  const int Before = ItemIndex();
  auto* Target = dynamic_cast<TCollectionItem*>(AParent->Item());
  if (!Target) return false;
  CollectionItem->SetIndex(Target->Index());
  Parent()->SetIndexOf(this, ItemIndex());
  return ItemIndex() != Before;
}

int TCollectionItemSprig::AddTypeCount() { return Parent() ? Parent()->AddTypeCount() : 0; }
String TCollectionItemSprig::GetAddType(int AIndex) { return Parent() ? Parent()->GetAddType(AIndex) : String(); }
void TCollectionItemSprig::AddType(int AIndex) {
  if (Parent()) Parent()->AddType(AIndex);
}

} // namespace formkit
