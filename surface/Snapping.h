//===- surface/Snapping.h - Guides and the drag-time view of items -------===//
//
// The pieces of guide snapping that are objects: a guide of an item that does
// not move (`TGuideInstance`), the drag-time view of an item in surface
// coordinates (`TItemWrapper`), and the dragged item's guides with its
// baselines first (`TItemGuidelinesSorter`). The snapping operations
// themselves belong to `TDesigner` (surface/GestureEngine.h) and are defined in
// surface/Snapping.cpp.
//
// Example:
//   IPtr<IItemWrapper> W = NewAs<IItemWrapper, TItemWrapper>(Item, Designer);
//   W->SetOffset({8, 0});
//   W->GetLeft();      // the item's left in surface coordinates, 8 further while moving
//
//===----------------------------------------------------------------------===//
#pragma once

#include "surface/Designer.h"

#include <utility>

namespace formkit {

class TDesigner;

/// The drag-time view of an item: its rectangles in surface coordinates and a
/// travelling offset that is added while the engine moves something. Until
/// `SetBoundsRect` the rectangles are read anew from the item on each access;
/// afterwards they describe the box as it will be. Holds the engine by a plain back
/// reference: a wrapper never outlives its drag.
class FK_API TItemWrapper : public TInterfacedObject, public IItemWrapper {
  FK_CLASS(TItemWrapper, TInterfacedObject)
  FK_INTERFACES(IItemWrapper)

  TItemWrapper() = default;
  TItemWrapper(const IPtr<IItemEx>& Item, TDesigner* Designer) : FItem(Item), FDesigner(Designer) {}

  int GetLeft() override { return GetBoundsRect().Left; }
  int GetTop() override { return GetBoundsRect().Top; }
  int GetRight() override { return GetBoundsRect().Right; }
  int GetBottom() override { return GetBoundsRect().Bottom; }
  TPoint GetOffset() override { return FOffset; }
  int GetPaddedLeft() override { return GetPaddedBoundsRect().Left; }
  int GetPaddedTop() override { return GetPaddedBoundsRect().Top; }
  int GetPaddedRight() override { return GetPaddedBoundsRect().Right; }
  int GetPaddedBottom() override { return GetPaddedBoundsRect().Bottom; }
  IPtr<IItemEx> GetItem() override { return FItem; }
  TRect GetBoundsRect() override;
  TRect GetPaddedBoundsRect() override;
  TRect GetClientRect() override;
  /// A new offset makes the rectangles be read from the item again.
  void SetOffset(const TPoint& Offset) override;
  /// `Rect` in the parent's coordinates becomes the bounds; the padded bounds keep
  /// their distances to it.
  void SetBoundsRect(const TRect& Rect) override;

private:
  void Validate();
  IPtr<IItem> ConversionParent();
  TRect ToSurface(const IPtr<IItem>& Parent, const TRect& R);
  TRect Travelled(TRect R);

  IPtr<IItemEx> FItem;
  bool FValidRect = false;
  TRect FClientRect, FBoundsRect, FPaddedBoundsRect;
  TPoint FOffset;
  TDesigner* FDesigner = nullptr;
};

/// One guide of an item that does not take part in a drag. Plain value, kept in the
/// engine's sorted guide lists; the guides of one item share its wrapper.
struct FK_API TGuideInstance {
  /// The position on the axis, in the container item's coordinates.
  int FGuide = 0;
  TGuideType FGuideType = gtAlignLeft;
  /// The owner as the drag sees it.
  IPtr<IItemWrapper> FItem;
  /// The owner's padded bounds in surface coordinates.
  TRect FGuideRect;
};

/// The engine's guides of one axis, ascending by position.
using TGuideList = std::vector<TGuideInstance>;

/// A copy of an item's guides with the baselines first, each pass in the list's order:
/// the order decides ties between guides at equal distance.
class FK_API TItemGuidelinesSorter : public TInterfacedObject, public IItemGuidelines {
  FK_CLASS(TItemGuidelinesSorter, TInterfacedObject)
  FK_INTERFACES(IItemGuidelines)

  TItemGuidelinesSorter() = default;
  /// Copies `Guides`; null gives an empty list.
  explicit TItemGuidelinesSorter(const IPtr<IItemGuidelines>& Guides);

  int GetCount() override { return static_cast<int>(FGuides.size()); }
  /// Raises `EListError` out of range.
  TGuideType GetDesignerGuideType(int Index) override;
  int GetDesignerGuideOffset(int Index) override;

private:
  std::vector<std::pair<TGuideType, int>> FGuides;
};

} // namespace formkit
