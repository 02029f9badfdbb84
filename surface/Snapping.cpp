//===- surface/Snapping.cpp - Grid, guides and guide lines ---------------===//
//
// Snapping of a drag to the grid and to the guides of the other items, the
// drag-time view of items, and the guide lines shown where guides coincide.
// A pull works within one grid step; a line is drawn only on exact coincidence.
//
// The guide lists are sorted by position, and every test that accepts a guide
// also requires it to lie within the current pull distance of the dragged
// guide. The searches therefore start at the first guide in reach and stop
// after the last one, which gives the same answers as a walk over the whole
// list at a cost that does not grow with the number of items on the surface.
//
// Example:
//   Designer->SnapToGrid(-5, 0, 8, false);   // -8
//   Designer->SnapToGrid(7, 3, 8, false);    // 11
//
//===----------------------------------------------------------------------===//
#include "surface/GestureEngine.h"

#include <algorithm>
#include <cstdlib>

namespace formkit {

FK_IMPLEMENT(TItemWrapper, "Designer") {}
FK_IMPLEMENT(TItemGuidelinesSorter, "Designer") {}

namespace {

/// The first guide at or after `Position`.
inline TGuideList::const_iterator FirstGuideFrom(const TGuideList& List, long long Position) {
  return std::lower_bound(List.begin(), List.end(), Position,
                          [](const TGuideInstance& G, long long P) { return G.FGuide < P; });
}

/// Intervals [A1, A2] and [B1, B2] overlap or touch.
inline bool SpansMeet(int A1, int A2, int B1, int B2) noexcept { return A1 <= B2 && B1 <= A2; }

/// A margin of the dragged item pairs with the opposite margin of a neighbour, or with
/// the same side's padding of its parent.
inline bool MarginPairs(TGuideType Dragged, TGuideType Other, bool IsParent) noexcept {
  if (Dragged == Other) return false;
  switch (Dragged) {
  case gtMarginLeft: return Other == gtMarginRight || (IsParent && Other == gtPaddingLeft);
  case gtMarginRight: return Other == gtMarginLeft || (IsParent && Other == gtPaddingRight);
  case gtMarginTop: return Other == gtMarginBottom || (IsParent && Other == gtPaddingTop);
  case gtMarginBottom: return Other == gtMarginTop || (IsParent && Other == gtPaddingBottom);
  default: return false;
  }
}

inline bool IsAlignOrBaseline(TGuideType T) noexcept {
  return T == gtAlignLeft || T == gtAlignTop || T == gtAlignRight || T == gtAlignBottom ||
         T == gtBaseline;
}

} // namespace

//===----------------------------------------------------------------------===//
// TItemWrapper
//===----------------------------------------------------------------------===//

IPtr<IItem> TItemWrapper::ConversionParent() {
  IPtr<IItem> Parent = FItem->GetParent();
  if (!Parent && FDesigner && FDesigner->FDesignSurface) {
    // An item without an item parent may still be nested as a component.
    if (TComponent* C = ExtractComponent(IPtr<IItem>(FItem)))
      if (TComponent* P = C->GetParentComponent())
        Parent = FDesigner->FDesignSurface->ItemFromComponent(P);
  }
  return Parent;
}

TRect TItemWrapper::ToSurface(const IPtr<IItem>& Parent, const TRect& R) {
  IDesignSurface* Surface = FDesigner ? FDesigner->FDesignSurface.Get() : nullptr;
  auto Convert = [&](TPoint P) {
    if (Parent) P = Parent->LocalToGlobal(P);
    if (Surface) P = Surface->GlobalToDesign(P);
    return P;
  };
  const TPoint A = Convert(R.TopLeft()), B = Convert(R.BottomRight());
  return TRect{A.X, A.Y, B.X, B.Y};
}

void TItemWrapper::Validate() {
  if (FValidRect) return;
  IPtr<IItem> Parent = ConversionParent();
  FBoundsRect = ToSurface(Parent, FItem->GetBoundsRect());
  FPaddedBoundsRect = ToSurface(Parent, FItem->GetPaddedBoundsRect());
  FClientRect = Parent ? ToSurface(Parent, FItem->GetClientRect()) : FItem->GetClientRect();
}

TRect TItemWrapper::Travelled(TRect R) {
  if (FDesigner && FDesigner->FDragAction == daMove) R.Offset(FOffset.X, FOffset.Y);
  return R;
}

TRect TItemWrapper::GetBoundsRect() {
  Validate();
  return Travelled(FBoundsRect);
}

TRect TItemWrapper::GetPaddedBoundsRect() {
  Validate();
  return Travelled(FPaddedBoundsRect);
}

TRect TItemWrapper::GetClientRect() {
  Validate();
  return Travelled(FClientRect);
}

void TItemWrapper::SetOffset(const TPoint& Offset) {
  if (Offset == FOffset) return;
  FOffset = Offset;
  FValidRect = false;
}

void TItemWrapper::SetBoundsRect(const TRect& Rect) {
  Validate(); // the margins are measured on what the item is now
  const TRect Margins{FBoundsRect.Left - FPaddedBoundsRect.Left, FBoundsRect.Top - FPaddedBoundsRect.Top,
                      FBoundsRect.Right - FPaddedBoundsRect.Right,
                      FBoundsRect.Bottom - FPaddedBoundsRect.Bottom};
  TRect Padded{Rect.Left - Margins.Left, Rect.Top - Margins.Top, Rect.Right - Margins.Right,
               Rect.Bottom - Margins.Bottom};
  TRect Bounds = Rect;
  if (IPtr<IItem> Parent = FItem->GetParent()) {
    Bounds = ToSurface(Parent, Bounds);
    Padded = ToSurface(Parent, Padded);
  }
  FBoundsRect = Bounds;
  FPaddedBoundsRect = Padded;
  FValidRect = true;
}

//===----------------------------------------------------------------------===//
// TItemGuidelinesSorter
//===----------------------------------------------------------------------===//

TItemGuidelinesSorter::TItemGuidelinesSorter(const IPtr<IItemGuidelines>& Guides) {
  if (!Guides) return;
  const int Count = Guides->GetCount();
  FGuides.reserve(Count);
  // Baselines first: a baseline within reach ends the search, so it beats nearer edges.
  for (int Pass = 0; Pass < 2; ++Pass)
    for (int I = 0; I < Count; ++I) {
      const TGuideType T = Guides->GetDesignerGuideType(I);
      if ((T == gtBaseline) == (Pass == 0)) FGuides.emplace_back(T, Guides->GetDesignerGuideOffset(I));
    }
}

TGuideType TItemGuidelinesSorter::GetDesignerGuideType(int Index) {
  if (Index < 0 || Index >= GetCount()) throw EListError(SSelectionIndexError, Index);
  return FGuides[Index].first;
}

int TItemGuidelinesSorter::GetDesignerGuideOffset(int Index) {
  if (Index < 0 || Index >= GetCount()) throw EListError(SSelectionIndexError, Index);
  return FGuides[Index].second;
}

//===----------------------------------------------------------------------===//
// Grid
//===----------------------------------------------------------------------===//

int TDesigner::SnapToGrid(int Value, int Origin, int GridSize, bool Force) {
  if (GridSize < 1) throw EArgumentOutOfRangeException(SInvalidGridSize, GridSize, GridSize);
  if (!Force && (!FGridAlign || (FDesignSurface && FDesignSurface->GridSnapDisabled()))) return Value;
  long long V = static_cast<long long>(Value) + GridSize / 2 - Origin;
  if (V < 0) V -= GridSize - 1; // with the truncating remainder below: floor division
  return static_cast<int>(V - V % GridSize + Origin);
}

TPoint TDesigner::PointToGrid(const TPoint& Point, bool Force) {
  const TPoint Origin = FDesignSurface ? FDesignSurface->GetOrigin() : TPoint{};
  return TPoint{SnapToGrid(Point.X, Origin.X, FGridSize.X, Force),
                SnapToGrid(Point.Y, Origin.Y, FGridSize.Y, Force)};
}

//===----------------------------------------------------------------------===//
// Guides
//===----------------------------------------------------------------------===//

void TDesigner::GetGuides() {
  FHorzGuides.clear();
  FVertGuides.clear();
  auto AddGuides = [&](const IPtr<IItem>& Item) {
    IPtr<IItemEx> Ex = QueryAs<IItemEx>(Item);
    if (!Ex || !Ex->HasGuidelines()) return;
    IPtr<IItemGuidelines> Guides = Ex->GetItemGuidelines();
    if (!Guides) return;
    // One wrapper and one converted rectangle serve all guides of the item.
    TGuideInstance Proto;
    Proto.FItem = NewAs<IItemWrapper, TItemWrapper>(Ex, this);
    Proto.FGuideRect = Ex->GetPaddedBoundsRect();
    if (IPtr<IItem> Parent = Ex->GetParent()) {
      auto Convert = [&](TPoint P) { return FDesignSurface->GlobalToDesign(Parent->LocalToGlobal(P)); };
      const TPoint A = Convert(Proto.FGuideRect.TopLeft()), B = Convert(Proto.FGuideRect.BottomRight());
      Proto.FGuideRect = TRect{A.X, A.Y, B.X, B.Y};
    }
    const int Count = Guides->GetCount();
    for (int I = 0; I < Count; ++I) {
      Proto.FGuideType = Guides->GetDesignerGuideType(I);
      Proto.FGuide = Guides->GetDesignerGuideOffset(I);
      (IsHorzGuide(Proto.FGuideType) ? FHorzGuides : FVertGuides).push_back(Proto);
    }
  };
  const int Count = FDesignSurface->GetItemsCount();
  for (int I = 0; I < Count; ++I) {
    IPtr<IItem> Item = FDesignSurface->GetItems(I);
    if (Item && !FDesignSurface->ItemInSelections(FSelections, Item)) AddGuides(Item);
  }
  AddGuides(FDesignSurface->GetContainerItem());
  auto ByPosition = [](const TGuideInstance& A, const TGuideInstance& B) { return A.FGuide < B.FGuide; };
  std::stable_sort(FHorzGuides.begin(), FHorzGuides.end(), ByPosition);
  std::stable_sort(FVertGuides.begin(), FVertGuides.end(), ByPosition);
}

bool TDesigner::GuideStepsEnabled() {
  return FGuidelines && FDesignSurface && !FDesignSurface->GridSnapDisabled() &&
         FDesignSurface->GetGuidelinePainter() && FDragItem && FDragGuide;
}

bool TDesigner::SnapToAlignGuide(int& Position, const IPtr<IItemGuidelines>& Guides,
                                 const TGuideList& List, TGuideTypes Types) {
  if (!Guides || !GuideStepsEnabled()) return false;
  IPtr<IItem> Parent = FDragItem->GetItem()->GetParent();
  if (!Parent) return false;
  const bool AxisY = Types.Contains(gtAlignTop) || Types.Contains(gtAlignBottom) || Types.Contains(gtBaseline);
  const TRect Client = Parent->GetClientRect();
  const int Low = AxisY ? Client.Top : Client.Left, High = AxisY ? Client.Bottom : Client.Right;
  const int Start = Position;
  int Limit = AxisY ? FGridSize.Y : FGridSize.X;
  const TPoint Offset = FDragItem->GetOffset();
  const int Travel = AxisY ? Offset.Y : Offset.X;
  bool Result = false;

  const int Count = Guides->GetCount();
  for (int I = 0; I < Count; ++I) {
    const TGuideType T = Guides->GetDesignerGuideType(I);
    if (!Types.Contains(T)) continue;
    const long long P = static_cast<long long>(Guides->GetDesignerGuideOffset(I)) + Travel;
    for (auto G = FirstGuideFrom(List, P - Limit); G != List.end() && G->FGuide <= P + Limit; ++G) {
      if (G->FGuide < Low || G->FGuide > High || G->FGuideType != T) continue;
      const long long D = G->FGuide - P;
      if (std::llabs(D) > Limit) continue;
      Result = true;
      Limit = static_cast<int>(std::llabs(D));
      Position = static_cast<int>(Start + D);
      if (Limit == 0 || T == gtBaseline) return true;
    }
  }
  return Result;
}

bool TDesigner::SnapToMarginGuide(const IPtr<IItemWrapper>& Item, int& Position,
                                  const IPtr<IItemGuidelines>& Guides, const TGuideList& List,
                                  TGuideTypes Types) {
  if (!Item || !Guides || !GuideStepsEnabled()) return false;
  const bool AxisY = Types.Contains(gtMarginTop) || Types.Contains(gtMarginBottom);
  const int Start = Position;
  int Limit = AxisY ? FGridSize.Y : FGridSize.X;
  const TPoint Offset = Item->GetOffset();
  const int Travel = AxisY ? Offset.Y : Offset.X;
  const TRect Padded = Item->GetPaddedBoundsRect();
  const int Cross1 = AxisY ? Padded.Left : Padded.Top, Cross2 = AxisY ? Padded.Right : Padded.Bottom;
  const TRect Dragged = FDragItem->GetBoundsRect();
  IPtr<IItem> Container = FDesignSurface->GetContainerItem();
  const TRect Client = Container ? Container->GetClientRect() : TRect{};
  IPtr<IItem> DraggedParent = FDragItem->GetItem()->GetParent();
  bool Result = false;

  const int Count = Guides->GetCount();
  for (int I = 0; I < Count; ++I) {
    const TGuideType T = Guides->GetDesignerGuideType(I);
    if (!Types.Contains(T)) continue;
    const long long P = static_cast<long long>(Guides->GetDesignerGuideOffset(I)) + Travel;
    for (auto G = FirstGuideFrom(List, P - Limit); G != List.end() && G->FGuide <= P + Limit; ++G) {
      // The cheap tests first; all of them are plain filters, so their order is free.
      if (G->FGuideType == T) continue;
      const long long D = G->FGuide - P;
      if (std::llabs(D) > Limit) continue;
      const int GCross1 = AxisY ? G->FGuideRect.Left : G->FGuideRect.Top;
      const int GCross2 = AxisY ? G->FGuideRect.Right : G->FGuideRect.Bottom;
      if (!SpansMeet(GCross1, GCross2, Cross1, Cross2)) continue;
      const bool IsParent = SameItem(DraggedParent, IPtr<IItem>(G->FItem->GetItem()));
      if (!MarginPairs(T, G->FGuideType, IsParent)) continue;
      const TRect OwnerBounds = G->FItem->GetBoundsRect();
      TRect Overlap;
      if (!IsParent && IntersectRect(Overlap, Dragged, OwnerBounds)) continue;
      if (IsParent) {
        const int CLow = AxisY ? Client.Top : Client.Left, CHigh = AxisY ? Client.Bottom : Client.Right;
        const int OLow = AxisY ? OwnerBounds.Top : OwnerBounds.Left;
        const int OHigh = AxisY ? OwnerBounds.Bottom : OwnerBounds.Right;
        if (P < CLow || P > CHigh || P < OLow || P > OHigh) continue;
      }
      Result = true;
      Limit = static_cast<int>(std::llabs(D));
      Position = static_cast<int>(Start + D);
      if (Limit == 0) return true;
    }
  }
  return Result;
}

void TDesigner::GenerateGuidelines() {
  IPtr<IGuidelinePainter> Painter = FDesignSurface ? FDesignSurface->GetGuidelinePainter() : nullptr;
  if (!Painter) return;
  Painter->BeginPaint();
  Painter->ClearGuides();
  if (FDragItem && FDragGuide) {
    const TRect W = FDragItem->GetBoundsRect();
    const TRect WPadded = FDragItem->GetPaddedBoundsRect();
    const TPoint WOffset = FDragItem->GetOffset();
    IPtr<IItem> Container = FDesignSurface->GetContainerItem();
    const TRect Client = Container ? Container->GetClientRect() : TRect{};
    IPtr<IItem> DraggedParent = FDragItem->GetItem()->GetParent();

    const int Count = FDragGuide->GetCount();
    for (int I = 0; I < Count; ++I) {
      const TGuideType T = FDragGuide->GetDesignerGuideType(I);
      const bool Horz = FAllowedHorzGuides.Contains(T);
      if (!Horz && !FAllowedVertGuides.Contains(T)) continue;
      const long long P = static_cast<long long>(FDragGuide->GetDesignerGuideOffset(I)) + (Horz ? WOffset.Y : WOffset.X);
      const TGuideList& List = Horz ? FHorzGuides : FVertGuides;
      for (auto G = FirstGuideFrom(List, P); G != List.end() && G->FGuide == P; ++G) {
        const IPtr<IItemWrapper>& OwnerW = G->FItem;
        const TRect O = OwnerW->GetBoundsRect();
        const int Pos = G->FGuide;
        if (IsAlignOrBaseline(G->FGuideType)) {
          if (G->FGuideType != T) continue;
          if (Horz) {
            if (Pos < Client.Top || Pos > Client.Bottom) continue;
            if (O.Left >= W.Left) Painter->AddGuide(TRect{W.Left, Pos, O.Right, Pos}, G->FGuideType);
            else Painter->AddGuide(TRect{O.Left, Pos, W.Right, Pos}, G->FGuideType);
          } else {
            if (Pos < Client.Left || Pos > Client.Right) continue;
            if (O.Top >= W.Top) Painter->AddGuide(TRect{Pos, W.Top, Pos, O.Bottom}, G->FGuideType);
            else Painter->AddGuide(TRect{Pos, O.Top, Pos, W.Bottom}, G->FGuideType);
          }
          continue;
        }
        const bool IsParent = SameItem(DraggedParent, IPtr<IItem>(OwnerW->GetItem()));
        TRect Overlap;
        if (!IsParent && IntersectRect(Overlap, W, O)) continue;
        if (!MarginPairs(T, G->FGuideType, IsParent)) continue;
        const bool FarSide = G->FGuideType == gtMarginTop || G->FGuideType == gtPaddingBottom ||
                             G->FGuideType == gtMarginLeft || G->FGuideType == gtPaddingRight;
        if (Horz) {
          if (!SpansMeet(WPadded.Left, WPadded.Right, G->FGuideRect.Left, G->FGuideRect.Right)) continue;
          const int X = IsParent ? (W.Right - W.Left) / 2 + W.Left
                                 : (std::min(W.Right, O.Right) - std::max(W.Left, O.Left)) / 2 + std::max(W.Left, O.Left);
          TRect Line = IsParent ? TRect{X, O.Top, X, W.Top} : TRect{X, O.Bottom, X, W.Top};
          if (FarSide) Line = IsParent ? TRect{X, W.Bottom, X, O.Bottom} : TRect{X, W.Bottom, X, O.Top};
          Painter->AddGuide(Line, G->FGuideType);
        } else {
          if (!SpansMeet(WPadded.Top, WPadded.Bottom, G->FGuideRect.Top, G->FGuideRect.Bottom)) continue;
          const int Y = IsParent ? (W.Bottom - W.Top) / 2 + W.Top
                                 : (std::min(W.Bottom, O.Bottom) - std::max(W.Top, O.Top)) / 2 + std::max(W.Top, O.Top);
          TRect Line = IsParent ? TRect{O.Left, Y, W.Left, Y} : TRect{O.Right, Y, W.Left, Y};
          if (FarSide) Line = IsParent ? TRect{W.Right, Y, O.Right, Y} : TRect{W.Right, Y, O.Left, Y};
          Painter->AddGuide(Line, G->FGuideType);
        }
      }
    }
  }
  Painter->EndPaint();
}

} // namespace formkit
