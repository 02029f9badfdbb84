//===- surface/DragBoxes.cpp - XOR drag boxes ----------------------------===//
//
// The list of boxes and the erase-and-redraw discipline of `TXorDragBoxes`.
// The engine's side (which boxes a drag gets) is in surface/Gestures.cpp.
//
// Example:
//   Boxes->Change(0, NewRect, daSize);   // erase at the old place, draw at the new
//
//===----------------------------------------------------------------------===//
#include "surface/DragBoxes.h"

#include <climits>

namespace formkit {

int& DragChangeCounter() noexcept {
  static int Counter = 0;
  return Counter;
}

FK_IMPLEMENT(TXorDragBoxes, "Designer") {}

int TXorDragBoxes::Add(const TRect& Rect, TDesignBoxStyle Style, TDragAction Action) {
  return Add(Rect, IPtr<IDragImage>(), Style, Action);
}

int TXorDragBoxes::Add(const TRect& Rect, const IPtr<IDragImage>& Image, TDesignBoxStyle Style,
                       TDragAction) {
  if (Capacity() == FUsed) {
    // Doubling by hand rather than by the vector's growth keeps the three arrays in
    // step at a capacity the drawing code can rely on.
    size_t NewCapacity = FRects.empty() ? 2 : FRects.size() * 2;
    FRects.resize(NewCapacity);
    FKinds.resize(NewCapacity);
    FImages.resize(NewCapacity);
  }
  FRects[FUsed] = Rect;
  FKinds[FUsed] = Style;
  FImages[FUsed] = Image;
  DrawBox(Rect, Image, Style);
  return FUsed++;
}

int TXorDragBoxes::Add(const IPtr<IItem2D>& Item, TDesignBoxStyle Style, TDragAction Action) {
  return Add(Item->GetBoundsRect(), IPtr<IDragImage>(), Style, Action);
}

void TXorDragBoxes::Change(int Index, const TRect& Rect, TDragAction) {
  ++DragChangeCounter();
  if (Index < 0 || Index >= FUsed) return;
  DrawBox(FRects[Index], FImages[Index], FKinds[Index]);
  FRects[Index] = Rect;
  DrawBox(FRects[Index], FImages[Index], FKinds[Index]);
}

void TXorDragBoxes::MoveBy(int DX, int DY, TDragAction) {
  DrawBoxes();
  for (int I = 0; I < FUsed; ++I) FRects[I].Offset(DX, DY);
  DrawBoxes();
}

void TXorDragBoxes::Done() {
  DrawBoxes();
  for (int I = 0; I < FUsed; ++I) FImages[I] = nullptr;
  FUsed = 0;
}

void TXorDragBoxes::DrawBoxes() {
  for (int I = 0; I < FUsed; ++I) DrawBox(FRects[I], FImages[I], FKinds[I]);
}

void TXorDragBoxes::DrawBox(const TRect& Rect, const IPtr<IDragImage>&, TDesignBoxStyle Style) {
  DrawBox(Rect, Style);
}

TRect TXorDragBoxes::BoundingRect() const {
  TRect R{INT_MAX, INT_MAX, -INT_MAX, -INT_MAX};
  for (int I = 0; I < FUsed; ++I) {
    const TRect& B = FRects[I];
    if (B.Left < R.Left) R.Left = B.Left;
    if (B.Top < R.Top) R.Top = B.Top;
    if (B.Right > R.Right) R.Right = B.Right;
    if (B.Bottom > R.Bottom) R.Bottom = B.Bottom;
  }
  return R;
}

} // namespace formkit
