//===- surface/Gestures.cpp - Presses, drags and their outcomes ----------===//
//
// The mouse side of `TDesigner`: what a press means, the drag from press to
// release, the feedback boxes, and the final steps that create, select, move
// or size. A click is a drag of length zero, which the final steps recognise.
//
// Example:
//   Listener->MouseDown(Root, {}, 5, 5, false, {}, false);   // rubber band
//   Listener->MouseMove(60, 40);
//   Listener->MouseUp(60, 40);                                // selects what it touched
//
//===----------------------------------------------------------------------===//
#include "surface/GestureEngine.h"

#include <cstdlib>

namespace formkit {

FK_IMPLEMENT(TDesigner, "Designer") {}

namespace {
/// Left not beyond right, top not beyond bottom.
TRect Normalised(TRect R) noexcept {
  if (R.Left > R.Right) std::swap(R.Left, R.Right);
  if (R.Top > R.Bottom) std::swap(R.Top, R.Bottom);
  return R;
}

/// Runs `Step` inside one selection batch of `Designer`, so that listeners hear of it
/// once. The batch closes however `Step` ends; a listener that fails at the close of a
/// failed step cannot hide that failure, while after success its failure passes on.
template <class F> void InSelectionBatch(TDesigner& Designer, F&& Step) {
  Designer.BeginSelect();
  auto End = OnFailure([&Designer]() noexcept { RunIgnoringExceptions([&Designer] { Designer.EndSelect(); }); });
  Step();
  End.Dismiss();
  Designer.EndSelect();
}
} // namespace

TDesigner::TDesigner(const IPtr<IDesignSurface>& Surface, const IPtr<ISelections>& Selections,
                     const IPtr<ITools>& Tools)
    : FDesignSurface(Surface), FSelections(Selections), FTools(Tools) {
  if (!FSelections) FSelections = NewAs<ISelections, TSimpleSelections>();
  if (!FTools) FTools = NewAs<ITools, TNullTools>();
  if (FDesignSurface) {
    FDesignSurface->AddListener(IPtr<IDesignSurfaceListener>(this));
    FGrabHandles = FDesignSurface->GetGrabHandles();
  }
}

void TDesigner::BeforeDestruction() {
  Close();
  inherited::BeforeDestruction();
}

void TDesigner::Close() {
  if (IPtr<IDesignSurface> Surface = std::move(FDesignSurface)) {
    ResetDrag();
    Surface->RemoveListener(IPtr<IDesignSurfaceListener>(this));
  }
}

void TDesigner::AttachHandles(const IPtr<IItem>& Item) {
  if (FGrabHandles) FGrabHandles->AttachHandles(Item);
}

void TDesigner::Lock() {
  FLocked = true;
  if (FGrabHandles) FGrabHandles->RefreshHandles();
}

void TDesigner::Unlock() {
  FLocked = false;
  if (FGrabHandles) FGrabHandles->RefreshHandles();
}

void TDesigner::Modified() {
  if (FGrabHandles) FGrabHandles->RefreshHandles();
  if (FDesignSurface) FDesignSurface->Modified();
}

void TDesigner::SetGridSize(const TPoint& Size) {
  if (Size.X < 1 || Size.Y < 1) throw EArgumentOutOfRangeException(SInvalidGridSize, Size.X, Size.Y);
  FGridSize = Size;
}

//===----------------------------------------------------------------------===//
// Selection
//===----------------------------------------------------------------------===//

IPtr<IItem> TDesigner::SelectedItem() {
  return FSelections->GetCount() == 1 ? FSelections->GetItems(0) : nullptr;
}

void TDesigner::Select(const IPtr<IItem>& Item, bool Add) {
  if (!Item) return;
  InSelectionBatch(*this, [&] {
    if (Add) {
      if (FSelections->Selected(Item)) FSelections->Remove(Item);
      else FSelections->Add(Item);
    } else {
      ClearSelection();
      FSelections->Add(Item);
    }
    // The handles go on the item that was passed, even where a toggle took it out
    // and another one is left: the surface repaints them on the next selection.
    if (FDragAction == daNone) AttachHandles(FSelections->GetCount() == 1 ? Item : nullptr);
  });
}

void TDesigner::Edit(const IPtr<IItem>& Item) {
  if (Item) Item->Edit();
}

void TDesigner::DeleteSelection() {
  DragCancel();
  if (FDesignSurface) FDesignSurface->DeleteSelection();
}

bool TDesigner::IsDesignerSelected() {
  return FDesignSurface && FSelections->Selected(FDesignSurface->GetRoot());
}

void TDesigner::ForceCommonSelectParent(const IPtr<IItem>& Parent) {
  InSelectionBatch(*this, [&] {
    for (int I = FSelections->GetCount() - 1; I >= 0; --I)
      if (!SameItem(FSelections->GetItems(I)->GetParent(), Parent)) FSelections->Remove(I);
  });
}

void TDesigner::BringToFront(const IPtr<IItem>& Item) {
  InSelectionBatch(*this, [&] {
    std::vector<IPtr<IItem>> Others;
    for (int I = FSelections->GetCount() - 1; I >= 0; --I) {
      IPtr<IItem> Entry = FSelections->GetItems(I);
      if (!Entry->Equals(Item)) {
        Others.push_back(Entry);
        FSelections->Remove(I);
      }
    }
    for (const IPtr<IItem>& Entry : Others) FSelections->Add(Entry);
  });
}

//===----------------------------------------------------------------------===//
// Mouse
//===----------------------------------------------------------------------===//

void TDesigner::MouseDown(const IPtr<IItem>& AItem, TShiftState Shift, int X, int Y,
                          bool DoubleClick, TMoveAffects Affects, bool NoDrag) {
  if (!FDesignSurface) return;
  DragCancel();
  FDragParent = nullptr;
  FDesignSurface->FocusSurface();
  // An exception leaves the engine idle.
  auto Idle = OnFailure([this]() noexcept { ResetDrag(); });
  IPtr<IItem> Item = AItem;
  const IPtr<IItem> Root = FDesignSurface->GetRoot();
  const bool ShiftDown = Shift.Contains(ssShift);
  const bool CtrlDown = Shift.Contains(ssCtrl);

  if (Item) {
    FDragParent = Item;
    if (ShiftDown && FSelections->GetCount() == 1 && !SameItem(Item, Root)) {
      IPtr<IItem> Parent = FSelections->GetItems(0)->GetParent();
      if (Parent && Parent->Contains(Item)) FDragParent = Parent;
    }
    while (FDragParent && FDragParent->GetParent() && !FDragParent->IsContainer())
      FDragParent = FDragParent->GetParent();
    while (Item && !Item->Selectable()) Item = Item->GetParent();
  }

  FDragAffects = AllMoveAffects;
  if (!Affects.Empty()) {
    if (FLocked) return; // a handle of a locked surface: no drag, no selection change
    FDragAffects = Affects;
    FDragAction = Affects == AllMoveAffects ? daMove : daSize;
  } else if (!FLocked) {
    FDragAction = daMove;
  }

  if (FTools->ToolSelected() && !NoDrag) {
    FDragAction = daCreate;
    ClearSelection();
  } else if (DoubleClick && !ShiftDown && !CtrlDown) {
    FDragAction = daNone;
    if (!SameItem(Item, Root) && (FSelections->GetCount() == 1 || FSelections->Selected(Item))) {
      Edit(Item);
    } else {
      Select(Item, false);
      Edit(Item);
    }
  } else if (SameItem(Item, Root) || CtrlDown) {
    FDragAction = daSelect;
    if (Item && !SameItem(Item, FDragParent) && Item->HasSelectableChildren()) FDragParent = Item;
    if (!ShiftDown) Select(Root, false);
  } else if (!ShiftDown) {
    FDragParent = Item ? Item->GetParent() : nullptr;
    if (!FSelections->Selected(Item)) {
      Select(Item, false);
    } else if (FSelections->GetCount() > 1 && !FSelections->GetItems(0)->Equals(Item)) {
      BringToFront(Item);
    }
    if (!FLocked) ForceCommonSelectParent(FDragParent);
  } else {
    FDragAction = daNone;
    Select(Item, true);
  }

  if (Shift.Contains(ssRight)) {
    FDragAction = daNone;
    if (FSelections->GetCount() == 1) AttachHandles(FSelections->GetItems(0));
    FDesignSurface->ShowContextMenu();
  }
  if (NoDrag) FDragAction = daNone;
  if (FDragAction != daNone) DragBegin(X, Y);
}

void TDesigner::MouseMove(int X, int Y) {
  if (FDragAction != daNone) DragTo(X, Y);
}

void TDesigner::MouseUp(int X, int Y) {
  if (FDragAction != daNone) DragEnd(X, Y, true);
}

void TDesigner::ResetDrag() noexcept {
  // Cleanup after a failure: everything of the drag goes, the boxes erased if they can be.
  FDragAction = daNone;
  FHorzGuides.clear();
  FVertGuides.clear();
  FDragGuide = nullptr;
  FDragItem = nullptr;
  FGuidelinePainter = nullptr;
  if (IPtr<IDragBoxes> Boxes = std::move(FBoxes)) RunIgnoringExceptions([&Boxes] { Boxes->Done(); });
  FBoxesEx = nullptr;
}

//===----------------------------------------------------------------------===//
// The drag
//===----------------------------------------------------------------------===//

void TDesigner::DragBegin(int X, int Y) {
  AttachHandles(nullptr);
  FBoxes = FDesignSurface->BeginDrag(FDragParent, TPoint{X, Y});
  FBoxesEx = QueryAs<IDragBoxesEx>(FBoxes);
  FGuidelinePainter = QueryAs<IGuidelinePainter>(FBoxes);
  FAnchor = TPoint{X, Y};

  IPtr<IItem> First = FSelections->GetCount() > 0 ? FSelections->GetItems(0) : nullptr;
  IPtr<IItemEx> FirstEx = QueryAs<IItemEx>(First);
  if ((FDragAction == daMove || FDragAction == daSize) && FirstEx) {
    if (FGuidelines) {
      FAllowedVertGuides = {};
      FAllowedHorzGuides = {};
      if (FDragAffects.Contains(gaLeft)) FAllowedVertGuides = FAllowedVertGuides + TGuideTypes{gtAlignLeft, gtMarginLeft};
      if (FDragAffects.Contains(gaRight)) FAllowedVertGuides = FAllowedVertGuides + TGuideTypes{gtAlignRight, gtMarginRight};
      if (FDragAffects.Contains(gaTop)) FAllowedHorzGuides = FAllowedHorzGuides + TGuideTypes{gtAlignTop, gtMarginTop};
      if (FDragAffects.Contains(gaBottom)) FAllowedHorzGuides = FAllowedHorzGuides + TGuideTypes{gtAlignBottom, gtMarginBottom};
      if (FDragAction == daMove) FAllowedHorzGuides.Include(gtBaseline);
      GetGuides();
      FDragGuide = NewAs<IItemGuidelines, TItemGuidelinesSorter>(FirstEx->GetItemGuidelines());
      FDragItem = NewAs<IItemWrapper, TItemWrapper>(FirstEx, this);
      GenerateGuidelines();
    }
    FOriginalBounds = FirstEx->GetBoundsRect();
  } else if (IPtr<IItem> Single = SelectedItem()) {
    FOriginalBounds = Single->GetBoundsRect();
  }

  FDragRect = GetDragRect(FAnchor, true);
  if (FDragItem && FDragAction == daMove) FDragItem->SetOffset(FDragRect.TopLeft());
  DragBoxesOn();
}

void TDesigner::DragTo(int X, int Y) {
  const TPoint Delta{X - FAnchor.X, Y - FAnchor.Y};
  if (FDragAction == daMove && FDragItem) FDragItem->SetOffset(Delta);
  const TRect New = GetDragRect(TPoint{X, Y}, Delta == TPoint{0, 0});
  if (New == FDragRect) return;
  DragBoxesMoveTo(New);
  if (FGuidelines && FDragItem) {
    if (FDragAction == daMove) FDragItem->SetOffset(New.TopLeft());
    GenerateGuidelines();
  }
  FDragRect = New;
}

void TDesigner::DragEnd(int, int, bool Accept) {
  if (FDragAction == daNone) return;
  FVertGuides.clear();
  FHorzGuides.clear();
  if (FGuidelinePainter) FGuidelinePainter->ClearGuides();
  FGuidelinePainter = nullptr;
  FDragGuide = nullptr;
  FDragItem = nullptr;
  if (!Accept && FBoxesEx) FBoxesEx->CancelDrag();
  DragBoxesOff();

  const TDragAction Action = FDragAction;
  FDragAction = daNone;
  InSelectionBatch(*this, [&] {
    // The handles go on a single selected item however the outcome ends.
    auto AttachToSingle = [this] {
      if (FSelections->GetCount() == 1) AttachHandles(FSelections->GetItems(0));
    };
    auto Handles = OnFailure([&]() noexcept { RunIgnoringExceptions(AttachToSingle); });
    if (Accept) {
      switch (Action) {
      case daCreate: DoDragCreate(); break;
      case daSelect: DoDragSelect(); break;
      case daMove: DoDragMove(); break;
      case daSize: DoDragSize(); break;
      case daNone: break;
      }
    }
    Handles.Dismiss();
    AttachToSingle();
  });
}

TRect TDesigner::GetDragRect(const TPoint& Point, bool AtAnchor) {
  switch (FDragAction) {
  case daCreate:
  case daSelect: {
    auto ToParent = [&](TPoint P) {
      P = FDesignSurface->DesignToGlobal(P);
      if (FDragParent) P = FDragParent->GlobalToLocal(P);
      if (FDragAction == daCreate) P = PointToGrid(P, false);
      return P;
    };
    const TPoint A = ToParent(FAnchor), B = ToParent(Point);
    TRect R = Normalised(TRect{A.X, A.Y, B.X, B.Y});
    if (FDragAction == daCreate) {
      ++R.Right; // a create box is never empty
      ++R.Bottom;
    }
    return R;
  }
  case daMove: {
    TRect R;
    const int DX = Point.X - FAnchor.X, DY = Point.Y - FAnchor.Y;
    if (AtAnchor) {
      R.Left = SnapToGrid(DX, 0, FGridSize.X, false);
      R.Top = SnapToGrid(DY, 0, FGridSize.Y, false);
      return R;
    }
    R.Left = DX;
    if (!SnapToMarginGuide(FDragItem, R.Left, FDragGuide, FVertGuides, {gtMarginLeft, gtMarginRight}) &&
        !SnapToAlignGuide(R.Left, FDragGuide, FVertGuides, {gtAlignLeft, gtAlignRight}))
      R.Left = SnapToGrid(DX, 0, FGridSize.X, false);
    R.Top = DY;
    if (!SnapToMarginGuide(FDragItem, R.Top, FDragGuide, FHorzGuides, {gtMarginTop, gtMarginBottom}) &&
        !SnapToAlignGuide(R.Top, FDragGuide, FHorzGuides, {gtAlignTop, gtAlignBottom, gtBaseline}))
      R.Top = SnapToGrid(DY, 0, FGridSize.Y, false);
    return R;
  }
  case daSize: return GetSizeRect(Point, AtAnchor);
  case daNone: break;
  }
  return FDragRect;
}

TRect TDesigner::GetSizeRect(const TPoint& Point, bool AtAnchor) {
  TPoint D{Point.X - FAnchor.X, Point.Y - FAnchor.Y};
  TRect R = FOriginalBounds;
  const bool UseGuides = !AtAnchor && FGuidelines && FDragItem;
  TRect Tentative = FOriginalBounds;
  if (UseGuides) {
    if (FDragAffects.Contains(gaLeft)) Tentative.Left += D.X;
    if (FDragAffects.Contains(gaTop)) Tentative.Top += D.Y;
    if (FDragAffects.Contains(gaRight)) Tentative.Right += D.X;
    if (FDragAffects.Contains(gaBottom)) Tentative.Bottom += D.Y;
    Tentative = Normalised(Tentative);
    FDragItem->SetOffset(D);
    FDragItem->SetBoundsRect(Tentative);
  }
  const TPoint Origin = FDesignSurface->GetOrigin();

  struct TEdge {
    TMoveAffect Affect;
    int TRect::*Field;
    bool Vertical; // a vertical edge lies on the X axis
    int Inclusive;
    TGuideType Margin, Align;
  };
  static constexpr TEdge Edges[] = {
      {gaLeft, &TRect::Left, true, 0, gtMarginLeft, gtAlignLeft},
      {gaTop, &TRect::Top, false, 0, gtMarginTop, gtAlignTop},
      {gaRight, &TRect::Right, true, 1, gtMarginRight, gtAlignRight},
      {gaBottom, &TRect::Bottom, false, 1, gtMarginBottom, gtAlignBottom},
  };
  for (const TEdge& E : Edges) {
    if (!FDragAffects.Contains(E.Affect)) continue;
    int& Delta = E.Vertical ? D.X : D.Y;
    const int V = FOriginalBounds.*E.Field;
    bool Guided = false;
    if (!AtAnchor) {
      int Value = Tentative.*E.Field;
      const TGuideList& List = E.Vertical ? FVertGuides : FHorzGuides;
      if (SnapToMarginGuide(FDragItem, Value, FDragGuide, List, {E.Margin}) ||
          SnapToAlignGuide(Value, FDragGuide, List, {E.Align})) {
        R.*E.Field = Value;
        Guided = true;
      }
    }
    if (!Guided) {
      // The edge leaves its place, which may lie off the grid, only when the pointer
      // has gone further than the distance to the grid line it would jump to.
      const int G = E.Vertical ? FGridSize.X : FGridSize.Y;
      const int O = E.Vertical ? Origin.X : Origin.Y;
      const int Raw = V + Delta;
      const int Snapped = SnapToGrid(Raw - E.Inclusive, O, G, false) + E.Inclusive;
      if (std::abs(V - Snapped) >= G || std::abs(Delta) > std::abs(Snapped - Raw))
        R.*E.Field = Snapped;
      else
        R.*E.Field = V;
    }
    Delta = R.*E.Field - V;
  }
  R = Normalised(R);
  if (UseGuides) {
    FDragItem->SetOffset(D);
    FDragItem->SetBoundsRect(R);
  }
  return R;
}

//===----------------------------------------------------------------------===//
// Outcomes
//===----------------------------------------------------------------------===//

void TDesigner::DoDragCreate() {
  const bool Scaled = DragChangeCounter() == 0;
  FDesignSurface->ValidateModification();
  IPtr<IItem> Item = FDesignSurface->CreateItem(FDragParent, FDragRect, Scaled);
  Select(Item, false);
  DragChangeCounter() = 0;
}

void TDesigner::DoDragSelect() {
  TRect Band = FDragRect;
  ++Band.Right; // a band whose edge touches an item takes it
  ++Band.Bottom;
  bool Replace = true;
  const int Count = FDesignSurface->GetItemsCount();
  for (int I = 0; I < Count; ++I) {
    IPtr<IItem> Item = FDesignSurface->GetItems(I);
    if (!Item) continue;
    if (IPtr<IComponentItem> C = QueryAs<IComponentItem>(Item); C && !C->DragSelectable()) continue;
    if (!SameItem(Item->GetParent(), FDragParent)) continue;
    TRect Overlap;
    if (IntersectRect(Overlap, Item->GetBoundsRect(), Band)) {
      Select(Item, !Replace);
      Replace = false;
    }
  }
}

void TDesigner::DoDragMove() {
  if (FDragRect.Left == 0 && FDragRect.Top == 0) return;
  FDesignSurface->ValidateModification();
  for (int I = 0; I < FSelections->GetCount(); ++I) {
    IPtr<IItem> Item = FSelections->GetItems(I);
    TRect B = Item->GetBoundsRect();
    B.Offset(FDragRect.Left, FDragRect.Top);
    Item->SetBoundsRect(B);
  }
  Modified();
}

void TDesigner::DoDragSize() {
  if (FDragRect == FOriginalBounds) return;
  IPtr<IItem> Item = SelectedItem();
  if (!Item) return;
  FDesignSurface->ValidateModification();
  Item->SetBoundsRect(FDragRect);
  Modified();
}

//===----------------------------------------------------------------------===//
// Feedback boxes
//===----------------------------------------------------------------------===//

void TDesigner::DragBoxesOn() {
  if (!FBoxes) return;
  switch (FDragAction) {
  case daCreate: FBoxes->Add(FDragRect, dbsItem, FDragAction); break;
  case daSelect: FBoxes->Add(FDragRect, dbsSelection, FDragAction); break;
  case daSize: {
    IPtr<IItem> Item = SelectedItem();
    if (!Item) break;
    IPtr<IItem2D> Item2D = QueryAs<IItem2D>(Item);
    if (FBoxesEx && Item2D) FBoxesEx->Add(Item2D, dbsItem, FDragAction);
    else FBoxes->Add(FDragRect, dbsItem, FDragAction);
    break;
  }
  case daMove:
    for (int I = 0; I < FSelections->GetCount(); ++I) {
      IPtr<IItem> Item = FSelections->GetItems(I);
      if (!SameItem(Item->GetParent(), FDragParent)) continue;
      IPtr<IItem2D> Item2D = FBoxesEx ? QueryAs<IItem2D>(Item) : nullptr;
      if (Item2D) {
        FBoxesEx->Add(Item2D, dbsItem, FDragAction);
        continue;
      }
      TRect B = Item->GetBoundsRect();
      B.Offset(FDragRect.Left, FDragRect.Top);
      IPtr<IItemEx> ItemEx = FBoxesEx ? QueryAs<IItemEx>(Item) : nullptr;
      if (ItemEx) FBoxesEx->Add(B, ItemEx->GetDragImage(), dbsItem, FDragAction);
      else FBoxes->Add(B, dbsItem, FDragAction);
    }
    break;
  case daNone: break;
  }
}

void TDesigner::DragBoxesMoveTo(const TRect& Rect) {
  if (!FBoxes) return;
  if (FDragAction == daMove)
    FBoxes->MoveBy(Rect.Left - FDragRect.Left, Rect.Top - FDragRect.Top, FDragAction);
  else
    FBoxes->Change(0, Rect, FDragAction);
}

void TDesigner::DragBoxesOff() {
  if (!FBoxes) return;
  FBoxes->Done();
  FBoxes = nullptr;
  FBoxesEx = nullptr;
  FGuidelinePainter = nullptr;
}

} // namespace formkit
