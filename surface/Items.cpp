//===- surface/Items.cpp - Item comparison and the persistent item base --===//
//
// `SameItem`, the extraction of an item's object, `TPersistentItem` and
// `TNullTools`.
//
// Example:
//   if (SameItem(Surface->GetRoot(), Item)) ...   // never compare the references
//
//===----------------------------------------------------------------------===//
#include "surface/Designer.h"

namespace formkit {

bool SameItem(const IPtr<IItem>& A, const IPtr<IItem>& B) {
  if (A == B) return true;
  if (!A || !B) return false;
  return A->Equals(B);
}

TPersistent* ExtractPersistent(const IPtr<IItem>& Item) {
  if (IPtr<IPersistentItem> P = QueryAs<IPersistentItem>(Item)) return P->GetItem();
  return nullptr;
}

TComponent* ExtractComponent(const IPtr<IItem>& Item) {
  return dynamic_cast<TComponent*>(ExtractPersistent(Item));
}

//===----------------------------------------------------------------------===//
// TPersistentItem
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPersistentItem, "Designer") {}

void* TPersistentItem::GetInterfaceEntry(const TGUID& IID) {
  // Two paths lead to IItem (through IItem2D and through IComponentItem); both have
  // the same overriders, so either serves. The optional abilities are left to
  // descendants, which name them in their own interface lists.
  if (IID == IItem::IID) return static_cast<IItem*>(static_cast<IItemEx*>(this));
  if (IID == IPersistentItem::IID) return static_cast<IPersistentItem*>(this);
  return inherited::GetInterfaceEntry(IID);
}

bool TPersistentItem::Contains(const IPtr<IItem>&) { return false; }

void TPersistentItem::Delete() {
  TPersistent* Instance = std::exchange(FInstance, nullptr);
  if (Instance) Instance->Destroy();
}

bool TPersistentItem::Equals(const IPtr<IItem>& Item) {
  IPtr<IPersistentItem> Other = QueryAs<IPersistentItem>(Item);
  return Other && Other->GetItem() == FInstance;
}

TRect TPersistentItem::GetBoundsRect() { return TRect{}; }

TRect TPersistentItem::GetExtendedRect() { return GetBoundsRect(); }

TRect TPersistentItem::GetClientRect() {
  TRect B = GetBoundsRect();
  return TRect{0, 0, B.Width(), B.Height()};
}

IPtr<IItem> TPersistentItem::GetParent() { return nullptr; }
bool TPersistentItem::IsContainer() { return false; }
bool TPersistentItem::HasSelectableChildren() { return false; }
void TPersistentItem::SetBoundsRect(const TRect&) {}
void TPersistentItem::ValidateDeletable() { throw Exception(SCantDeletePersistent); }
TPoint TPersistentItem::GlobalToLocal(const TPoint& Point) { return Point; }
TPoint TPersistentItem::LocalToGlobal(const TPoint& Point) { return Point; }
bool TPersistentItem::Selectable() { return false; }
void TPersistentItem::Edit() {}
bool TPersistentItem::DragSelectable() { return true; }
IPtr<IDragImage> TPersistentItem::GetDragImage() { return nullptr; }
IPtr<IItemGuidelines> TPersistentItem::GetItemGuidelines() { return nullptr; }
TRect TPersistentItem::GetPaddedBoundsRect() { return GetBoundsRect(); }
bool TPersistentItem::HasGuidelines() { return false; }
String TPersistentItem::GetNamePath() { return FInstance ? FInstance->GetNamePath() : String(); }

FK_IMPLEMENT(TNullTools, "Designer") {}

} // namespace formkit
