//===- core/root/RootItems.h - Items a root makes itself -----------------===//
//
// The items of components and persistents on a module: `TInternalItem` (with
// the component editor), `TComponentItem` (selectable by ownership, refusing to
// delete what an ancestor introduced) and `TNonControlItem` (an object with no
// place on the surface). A framework's items descend from `TComponentItem`.
//
// Example:
//   IPtr<IItem> Item = NewAs<IItem, TNonControlItem>(Font, Root->AsDesigner());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/root/ComponentDesignSurface.h"

namespace formkit {

class TComponentRoot;

FK_RESOURCESTRING(sCantDeleteAncestor, "Selection contains a component, %s, introduced in an ancestor and cannot be deleted");
FK_RESOURCESTRING(sCannotDeleteNonComponent, "Cannot delete a TPersistent from the designer");

/// An item that the root made: it knows its designer and the component editor.
class FK_API TInternalItem : public TPersistentItem, public IInternalItem {
  FK_CLASS(TInternalItem, TPersistentItem)
  FK_INTERFACES(IInternalItem)

  TInternalItem() = default;
  /// `Designer` must be an internal root: the item cannot live on another designer.
  TInternalItem(TPersistent* Instance, const IPtr<IDesigner>& Designer);

  // IItem, through one implementation.
  bool Contains(const IPtr<IItem>& Item) override { return TPersistentItem::Contains(Item); }
  void Delete() override { TPersistentItem::Delete(); }
  TPoint GlobalToLocal(const TPoint& P) override { return TPersistentItem::GlobalToLocal(P); }
  TPoint LocalToGlobal(const TPoint& P) override { return TPersistentItem::LocalToGlobal(P); }
  bool Equals(const IPtr<IItem>& Item) override { return TPersistentItem::Equals(Item); }
  TRect GetBoundsRect() override { return TPersistentItem::GetBoundsRect(); }
  TRect GetExtendedRect() override { return TPersistentItem::GetExtendedRect(); }
  TRect GetClientRect() override { return TPersistentItem::GetClientRect(); }
  IPtr<IItem> GetParent() override { return TPersistentItem::GetParent(); }
  bool IsContainer() override { return TPersistentItem::IsContainer(); }
  bool HasSelectableChildren() override { return TPersistentItem::HasSelectableChildren(); }
  void SetBoundsRect(const TRect& R) override { TPersistentItem::SetBoundsRect(R); }
  /// False.
  bool Selectable() override { return false; }
  void ValidateDeletable() override { TPersistentItem::ValidateDeletable(); }
  /// The component editor's `Edit`, when there is one.
  void Edit() override;

  // IInternalItem
  /// None.
  IPtr<IItem> GetChildren(int) override { return nullptr; }
  int GetChildCount() override { return 0; }
  /// The component editor, made at first use and kept.
  IPtr<IComponentEditor> GetEditor() override;
  bool GetMarked() override { return FMarked; }
  void SetMarked(bool Value) override { FMarked = Value; }
  void SetParent(const IPtr<IItem>&) override {}
  void Show() override {}
  void ZOrder(bool) override {}
  void FlipChildren() override {}

protected:
  IPtr<IComponentEditor> FEditor;
  IPtr<IInternalRoot> FInternalRoot;
  IPtr<IDesigner> FDesigner;
  bool FMarked = false;
};

/// The item of a component: selectable when the module owns it.
class FK_API TComponentItem : public TInternalItem {
  FK_CLASS(TComponentItem, TInternalItem)
  TComponentItem() = default;
  TComponentItem(TPersistent* Instance, const IPtr<IDesigner>& Designer) : TInternalItem(Instance, Designer) {}

  TComponent* GetComponent() const { return dynamic_cast<TComponent*>(FInstance); }
  /// The root, a component without owner, one the root owns, or one of a frame the
  /// module may change.
  bool Selectable() override;
  /// Raises `EComponentDesignerException` for a component introduced in an ancestor.
  void ValidateDeletable() override;
};

/// The item of an object with no place on the surface.
class FK_API TNonControlItem : public TComponentItem {
  FK_CLASS(TNonControlItem, TComponentItem)
  TNonControlItem() = default;
  TNonControlItem(TPersistent* Instance, const IPtr<IDesigner>& Designer) : TComponentItem(Instance, Designer) {}

  /// Off every surface: (-100, -100, -100, -100).
  TRect GetBoundsRect() override { return {-100, -100, -100, -100}; }
  TRect GetPaddedBoundsRect() override { return {-100, -100, -100, -100}; }
  TPoint GlobalToLocal(const TPoint&) override { return {0, 0}; }
  TPoint LocalToGlobal(const TPoint&) override { return {0, 0}; }
  IPtr<IItem> GetParent() override { return nullptr; }
  bool GetMarked() override { return false; }
  bool Selectable() override { return false; }
  void SetBoundsRect(const TRect&) override {}
  void SetMarked(bool) override {}
  /// After the component's own check, always raises `ECannotDeleteNonComponentException`.
  void ValidateDeletable() override;
};

} // namespace formkit
