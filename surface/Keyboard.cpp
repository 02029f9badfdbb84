//===- surface/Keyboard.cpp - Keys on a design surface -------------------===//
//
// What the gesture engine does with key events: a bare arrow walks to the
// nearest item in its direction, Ctrl+arrow moves by a pixel, Ctrl+Shift+arrow
// by a grid cell, Shift+arrow sizes by a pixel, Tab follows the tab order,
// Escape walks up to the parent (and goes on moving it during a move), and a
// modifier held alone shows the guide lines of the selection.
//
// Example:
//   Listener->Key(dkRight, {ssCtrl}, 0, false);   // the selection moves one pixel right
//   Listener->Key(dkEscape, {}, 0, false);        // the parent becomes the selection
//
//===----------------------------------------------------------------------===//
#include "surface/GestureEngine.h"

#include <cstdint>

namespace formkit {

namespace {
/// The unit step of each arrow key.
TPoint ArrowDelta(TDesignKeyCode Key) {
  switch (Key) {
  case dkLeft: return {-1, 0};
  case dkUp: return {0, -1};
  case dkRight: return {1, 0};
  case dkDown: return {0, 1};
  default: return {0, 0};
  }
}
} // namespace

void TDesigner::Key(TDesignKeyCode KeyCode, TShiftState Shift, char, bool KeyUp) {
  if (!FDesignSurface) return;
  if (KeyCode == dkNone) {
    if (!FGuidelines) return;
    if (KeyUp) {
      if (IPtr<IGuidelinePainter> Painter = FDesignSurface->GetGuidelinePainter()) Painter->ClearGuides();
      if (FDragAction == daNone) FGuidelinePainter = nullptr;
    } else if (!IsDesignerSelected() && (Shift.Contains(ssShift) || Shift.Contains(ssCtrl)) &&
               !FGuidelinePainter) {
      ShowGuides();
    }
    return;
  }
  if (KeyUp) return;
  switch (KeyCode) {
  case dkDelete: DeleteSelection(); break;
  case dkLeft:
  case dkUp:
  case dkRight:
  case dkDown: ArrowStep(KeyCode, Shift); break;
  case dkTab: Select(FDesignSurface->FindNextItem(SelectedItem(), !Shift.Contains(ssShift)), false); break;
  case dkEscape: EscapeStep(); break;
  default: break; // Enter, characters and unknown codes
  }
}

void TDesigner::ArrowStep(TDesignKeyCode Key, TShiftState Shift) {
  if (IsDesignerSelected()) return;
  TPoint Delta = ArrowDelta(Key);
  if (Shift.Contains(ssCtrl)) {
    if (Shift.Contains(ssShift)) Delta = TPoint{Delta.X * FGridSize.X, Delta.Y * FGridSize.Y};
    MoveBy(Delta, false);
    ShowGuides();
  } else if (Shift.Contains(ssShift)) {
    MoveBy(Delta, true);
    ShowGuides();
  } else if (IPtr<IItem> Item = SelectedItem()) {
    if (IPtr<IItem> Next = FindNearestItem(Item, Key)) Select(Next, false);
  }
}

void TDesigner::MoveBy(const TPoint& Delta, bool Resize) {
  if (FSelections->GetCount() == 0 || FLocked) return;
  FDesignSurface->ValidateModification();
  ForceCommonSelectParent(FSelections->GetItems(0)->GetParent());
  for (int I = 0; I < FSelections->GetCount(); ++I) {
    IPtr<IItem> Item = FSelections->GetItems(I);
    TRect B = Item->GetBoundsRect();
    if (Resize) {
      B.Right += Delta.X;
      B.Bottom += Delta.Y;
    } else {
      B.Offset(Delta.X, Delta.Y);
    }
    Item->SetBoundsRect(B);
  }
  Modified();
}

int TDesigner::SpanGap(int A1, int A2, int B1, int B2) noexcept {
  if (A1 > B2) return A1 - B2;
  if (A2 >= B1) return 0;
  return B1 - A2;
}

IPtr<IItem> TDesigner::FindNearestItem(const IPtr<IItem>& Item, TDesignKeyCode Key) {
  if (!Item || !FDesignSurface) return nullptr;
  const TRect Self = Item->GetBoundsRect();
  const int CX = (Self.Left + Self.Right) / 2, CY = (Self.Top + Self.Bottom) / 2;
  const IPtr<IItem> Parent = Item->GetParent();
  int Best = INT32_MAX;
  IPtr<IItem> Result;
  const int Count = FDesignSurface->GetItemsCount();
  for (int I = 0; I < Count; ++I) {
    IPtr<IItem> Other = FDesignSurface->GetItems(I);
    if (!Other || SameItem(Other, Item) || !SameItem(Other->GetParent(), Parent)) continue;
    const TRect R = Other->GetBoundsRect();
    const int DX = (R.Left + R.Right) / 2 - CX, DY = (R.Top + R.Bottom) / 2 - CY;
    int GapX = SpanGap(Self.Left, Self.Right, R.Left, R.Right);
    int GapY = SpanGap(Self.Top, Self.Bottom, R.Top, R.Bottom);
    bool Candidate = false;
    switch (Key) {
    case dkLeft: Candidate = DX < 0 && GapX >= GapY; break;
    case dkRight: Candidate = DX > 0 && GapX >= GapY; break;
    case dkUp: Candidate = DY < 0 && GapX <= GapY; break;
    case dkDown: Candidate = DY > 0 && GapX <= GapY; break;
    default: break;
    }
    if (!Candidate) continue;
    // Across the direction of travel the gap is measured from the centre line.
    if (Key == dkLeft || Key == dkRight) GapY = SpanGap(R.Top, R.Bottom, CY, CY);
    else GapX = SpanGap(R.Left, R.Right, CX, CX);
    // 32-bit arithmetic that wraps instead of overflowing.
    const std::uint32_t UX = static_cast<std::uint32_t>(GapX), UY = static_cast<std::uint32_t>(GapY);
    const int Distance = static_cast<std::int32_t>(UX * UX + UY * UY);
    if (Distance < Best) {
      Best = Distance;
      Result = Other;
    }
  }
  return Result;
}

void TDesigner::EscapeStep() {
  const TDragAction Action = FDragAction;
  if (Action != daNone) DragCancel();
  if (Action != daNone && Action != daMove) return;
  IPtr<IItem> Current = FSelections->GetCount() > 0 ? FSelections->GetItems(0) : nullptr;
  const IPtr<IItem> Root = FDesignSurface->GetRoot();
  if (Current && Current->GetParent() && !SameItem(Current, Root)) {
    do {
      Current = Current->GetParent();
    } while (Current && !SameItem(Current, Root) && !Current->Selectable());
    if (Current && !SameItem(Current, Root)) {
      Select(Current, false);
      if (Action == daMove) {
        const TPoint Cursor = FDesignSurface->GetCursorPoint();
        MouseDown(Current, TShiftState{}, Cursor.X, Cursor.Y, false, TMoveAffects{}, false);
      }
      return;
    }
  }
  if (Action == daNone) {
    ClearSelection();
    AttachHandles(nullptr);
  }
}

void TDesigner::ShowGuides() {
  if (!FGuidelines) return;
  FGuidelinePainter = FDesignSurface->GetGuidelinePainter();
  if (!FGuidelinePainter) return;
  IPtr<IItemEx> First = FSelections->GetCount() > 0 ? QueryAs<IItemEx>(FSelections->GetItems(0)) : nullptr;
  if (!First) return;
  FGuidelinePainter->BeginPaint();
  FGuidelinePainter->ClearGuides();
  FAllowedHorzGuides = HorzGuideTypes;
  FAllowedVertGuides = VertGuideTypes;
  FDragGuide = NewAs<IItemGuidelines, TItemGuidelinesSorter>(First->GetItemGuidelines());
  FDragItem = NewAs<IItemWrapper, TItemWrapper>(First, this);
  // The guides are shown, not kept for a drag: they go however the painting ends. Ending
  // the painting may fail; after a failure here that one passes on.
  auto End = OnFailure([this]() noexcept {
    ForgetGuides();
    RunIgnoringExceptions([this] { FGuidelinePainter->EndPaint(); });
  });
  GetGuides();
  GenerateGuidelines();
  End.Dismiss();
  ForgetGuides();
  FGuidelinePainter->EndPaint();
}

void TDesigner::ForgetGuides() noexcept {
  FHorzGuides.clear();
  FVertGuides.clear();
  FDragItem = nullptr;
  FDragGuide = nullptr;
}

} // namespace formkit
