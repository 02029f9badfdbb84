//===- surface/GestureEngine.h - The gesture engine of a surface ---------===//
//
// `TDesigner` turns the raw input of one surface into gestures: select, rubber
// band, move, resize, create, and the keyboard steps. It knows nothing of
// components or frameworks: it sees `IDesignSurface`, `IItem`, `ISelections`
// and `ITools`. There is no start threshold: a press opens a drag at once and a
// click is a drag that did not move, which the final steps treat as no change.
// Its operations are defined by theme in surface/Gestures.cpp (mouse and drag),
// surface/Snapping.cpp (grid and guides) and surface/Keyboard.cpp.
//
// Example:
//   IPtr<TDesigner> D = New<TDesigner>(Surface, NewAs<ISelections, TSimpleSelections>(), nullptr);
//   // the surface now sends its input to D:
//   Surface->Listener->MouseDown(Item, {}, 10, 10, false, {}, false);   // select and move
//   Surface->Listener->MouseMove(30, 10);
//   Surface->Listener->MouseUp(30, 10);                                  // moved by 16 on grid 8
//   D->Close();                                                          // leaves the surface
//
//===----------------------------------------------------------------------===//
#pragma once

#include "surface/DragBoxes.h"
#include "surface/Snapping.h"

namespace formkit {

FK_RESOURCESTRING(SInvalidGridSize, "Grid size must be positive in both directions (%d, %d)");

/// The gesture engine of one surface. It registers itself as the surface's listener
/// and holds the surface; `Close` undoes both, so call it before dropping the last
/// reference. Selections and tools may be null: it then uses its own list and no palette.
class FK_API TDesigner : public TInterfacedObject, public ISurfaceDesigner, public IDesignSurfaceListener {
  FK_CLASS(TDesigner, TInterfacedObject)
  FK_INTERFACES(ISurfaceDesigner, IDesignSurfaceListener)

  TDesigner() = default;
  TDesigner(const IPtr<IDesignSurface>& Surface, const IPtr<ISelections>& Selections,
            const IPtr<ITools>& Tools);
  void BeforeDestruction() override;

  // ISurfaceDesigner ------------------------------------------------------------
  /// Leaves the surface's listener slot and drops the surface.
  void Close() override;
  /// Cancels a running drag; nothing otherwise.
  void CancelDragging() override { DragCancel(); }
  bool GetLocked() override { return FLocked; }
  TPoint GetGridSize() override { return FGridSize; }
  void Lock() override;
  /// Refreshes the handles and reports the change to the surface.
  void Modified() override;
  TPoint PointToGrid(const TPoint& Point, bool Force) override;
  void SetGridSize(const TPoint& Size) override;
  void Unlock() override;
  bool GetGridAligned() override { return FGridAlign; }
  void SetGridAligned(bool Value) override { FGridAlign = Value; }
  bool GetGuidelines() override { return FGuidelines; }
  void SetGuidelines(bool Value) override { FGuidelines = Value; }
  IPtr<ISelections> GetSelections() override { return FSelections; }
  TDragAction GetDragAction() override { return FDragAction; }

  // IDesignSurfaceListener ------------------------------------------------------
  /// Decides what the press means and opens the drag. An exception leaves the engine
  /// idle and passes on.
  void MouseDown(const IPtr<IItem>& Item, TShiftState Shift, int X, int Y, bool DoubleClick,
                 TMoveAffects Affects, bool NoDrag) override;
  /// `DragTo` while a drag runs.
  void MouseMove(int X, int Y) override;
  /// Ends a running drag and carries it out; the point is not used.
  void MouseUp(int X, int Y) override;
  void Key(TDesignKeyCode KeyCode, TShiftState Shift, char Ch, bool KeyUp) override;

  // Selection -------------------------------------------------------------------
  void BeginSelect() { FSelections->BeginSelections(); }
  void EndSelect() { FSelections->EndSelections(); }
  void ClearSelection() { FSelections->Clear(); }
  /// The single selected item; null unless exactly one is selected.
  IPtr<IItem> SelectedItem();
  /// With `Add`, toggles `Item`; without, makes it the selection. Handles follow when
  /// no drag runs. Nothing for null.
  void Select(const IPtr<IItem>& Item, bool Add);
  /// The item's default action.
  void Edit(const IPtr<IItem>& Item);
  /// Cancels a drag, then lets the surface delete the selection.
  void DeleteSelection();
  /// Is the root item selected.
  bool IsDesignerSelected();
  /// Removes from the selection, in one batch, what does not lie directly in `Parent`.
  void ForceCommonSelectParent(const IPtr<IItem>& Parent);

  // Drag ------------------------------------------------------------------------
  /// The snapped feedback rectangle for the pointer at `Point`. For a move its left
  /// and top are the delta and right and bottom 0; for the other gestures it is in
  /// the drag parent's coordinates.
  TRect GetDragRect(const TPoint& Point, bool AtAnchor);
  /// The current feedback rectangle.
  TRect DragRect() const noexcept { return FDragRect; }
  /// The first selected item's bounds at the start of the drag.
  TRect OriginalBounds() const noexcept { return FOriginalBounds; }
  /// The item the gesture takes place in.
  IPtr<IItem> DragParent() const { return FDragParent; }

  // Grid and guides (surface/Snapping.cpp) ----------------------------------------
  /// `Value` rounded to the nearest line of a grid through `Origin`, ties upward, also
  /// below 0. Unless `Force`, the value is returned as it is while grid alignment is
  /// off or the surface disables the grid. Raises `EArgumentOutOfRangeException` for a
  /// step below 1.
  int SnapToGrid(int Value, int Origin, int GridSize, bool Force);
  /// Collects the guides of every item that does not take part in the drag, and of the
  /// container item, into the two sorted lists. O(n log n) in the number of guides.
  void GetGuides();
  /// Shows a line for each guide of the dragged item that coincides with another.
  void GenerateGuidelines();
  /// Pulls `Position` by the distance between the nearest pair of alignment guides of
  /// the same kind (kinds in `Types`), within one grid step; true if pulled.
  bool SnapToAlignGuide(int& Position, const IPtr<IItemGuidelines>& Guides, const TGuideList& List,
                        TGuideTypes Types);
  /// Pulls `Position` by the distance between the nearest pair of facing margins, or a
  /// margin and its parent's padding, within one grid step; true if pulled.
  bool SnapToMarginGuide(const IPtr<IItemWrapper>& Item, int& Position,
                         const IPtr<IItemGuidelines>& Guides, const TGuideList& List,
                         TGuideTypes Types);
  /// The collected guides of the running drag.
  const TGuideList& HorzGuides() const noexcept { return FHorzGuides; }
  const TGuideList& VertGuides() const noexcept { return FVertGuides; }

  // Keyboard (surface/Keyboard.cpp) ----------------------------------------------
  /// The item of the same parent nearest to `Item` in the direction of an arrow key;
  /// null if none lies that way. Ties go to the first in the surface's order. O(n).
  IPtr<IItem> FindNearestItem(const IPtr<IItem>& Item, TDesignKeyCode Key);
  /// Moves (or, with `Resize`, sizes by the right and bottom edges) every selected
  /// item by `Delta`, without snapping, after `ValidateModification`.
  void MoveBy(const TPoint& Delta, bool Resize);
  /// The distance between the intervals A and B; 0 when they touch or overlap.
  static int SpanGap(int A1, int A2, int B1, int B2) noexcept;

protected:
  void DragBegin(int X, int Y);
  void DragTo(int X, int Y);
  void DragEnd(int X, int Y, bool Accept);
  void DragCancel() { DragEnd(0, 0, false); }
  void DoDragCreate();
  void DoDragSelect();
  void DoDragMove();
  void DoDragSize();
  void DragBoxesOn();
  void DragBoxesMoveTo(const TRect& Rect);
  void DragBoxesOff();
  void ShowGuides();

private:
  friend class TItemWrapper;
  void BringToFront(const IPtr<IItem>& Item);
  void ResetDrag() noexcept;
  /// Drops the guide lists and the dragged item's guides once they were shown.
  void ForgetGuides() noexcept;
  bool GuideStepsEnabled();
  TRect GetSizeRect(const TPoint& Point, bool AtAnchor);
  void ArrowStep(TDesignKeyCode Key, TShiftState Shift);
  void EscapeStep();
  void AttachHandles(const IPtr<IItem>& Item);

  IPtr<IDesignSurface> FDesignSurface;
  IPtr<ISelections> FSelections;
  IPtr<IGrabHandles> FGrabHandles;
  IPtr<ITools> FTools;
  TPoint FGridSize{8, 8};
  TPoint FAnchor;
  TRect FDragRect;
  TMoveAffects FDragAffects = AllMoveAffects;
  TDragAction FDragAction = daNone;
  TRect FOriginalBounds;
  bool FLocked = false;
  bool FGridAlign = true;
  bool FGuidelines = true;
  IPtr<IItem> FDragParent;
  IPtr<IDragBoxes> FBoxes;
  IPtr<IDragBoxesEx> FBoxesEx;
  IPtr<IGuidelinePainter> FGuidelinePainter;
  TGuideList FHorzGuides, FVertGuides;
  IPtr<IItemGuidelines> FDragGuide;
  IPtr<IItemWrapper> FDragItem;
  TGuideTypes FAllowedHorzGuides, FAllowedVertGuides;
};

} // namespace formkit
