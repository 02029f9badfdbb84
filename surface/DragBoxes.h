//===- surface/DragBoxes.h - Feedback boxes of a running drag ------------===//
//
// While a gesture runs, items stay where they are and outline boxes (or images)
// show where they would go. `IDragBoxes` is what the gesture engine talks to;
// `TXorDragBoxes` keeps the boxes and the even bookkeeping of XOR drawing, in
// which drawing a box twice at one place removes it. A framework supplies the
// one abstract operation, the drawing of a box.
//
// Example:
//   class TMyBoxes : public TXorDragBoxes {
//     void DrawBox(const TRect& R, TDesignBoxStyle S) override { Canvas.XorFrame(R, S); }
//   };
//   IPtr<IDragBoxes> Boxes = NewAs<IDragBoxes, TMyBoxes>();
//   int I = Boxes->Add(Bounds(10, 10, 40, 20), dbsItem, daMove);   // drawn once
//   Boxes->MoveBy(8, 0, daMove);                                   // erased, drawn again
//   Boxes->Done();                                                 // all off
//
//===----------------------------------------------------------------------===//
#pragma once

#include "surface/Designer.h"

namespace formkit {

/// The feedback of one drag. Every box is on screen exactly once between `Add` and `Done`.
struct FK_API IDragBoxes : IInterface {
  FK_INTERFACE(IDragBoxes, IInterface, "{8B18F792-B662-5F26-8A0A-B997AD1A380E}")
  /// A new box, drawn at once; the result is its index.
  virtual int Add(const TRect& Rect, TDesignBoxStyle Style, TDragAction Action) = 0;
  /// Moves or resizes the box at `Index`.
  virtual void Change(int Index, const TRect& Rect, TDragAction Action) = 0;
  /// Shifts every box.
  virtual void MoveBy(int DX, int DY, TDragAction Action) = 0;
  /// The end of the drag: all boxes off.
  virtual void Done() = 0;
};

/// Drag boxes that can show images and whole items, and hear of a cancel.
struct FK_API IDragBoxesEx : IDragBoxes {
  FK_INTERFACE(IDragBoxesEx, IDragBoxes, "{D09A9465-C694-4A0A-9090-EC7C07677F31}")
  using IDragBoxes::Add;
  /// A box that shows `Image` (null for an outline).
  virtual int Add(const TRect& Rect, const IPtr<IDragImage>& Image, TDesignBoxStyle Style,
                  TDragAction Action) = 0;
  /// A box for an item as a whole.
  virtual int Add(const IPtr<IItem2D>& Item, TDesignBoxStyle Style, TDragAction Action) = 0;
  /// The user cancelled; called before `Done`.
  virtual void CancelDrag() = 0;
};

/// The process-wide count of box changes since the last creation: `TXorDragBoxes::Change`
/// raises it, a creation reads it (0 means "created by a click, at its default size")
/// and sets it back to 0. One user-interface thread only.
FK_API int& DragChangeCounter() noexcept;

/// The base of concrete drag boxes: the list of boxes and the XOR bookkeeping. The
/// arrays double when full, so n boxes allocate O(log n) times. `Action` arguments are
/// ignored here; a concrete class may use them.
class FK_API TXorDragBoxes : public TInterfacedObject, public IDragBoxesEx {
  FK_CLASS(TXorDragBoxes, TInterfacedObject)
  FK_INTERFACES(IDragBoxesEx)

  int Add(const TRect& Rect, TDesignBoxStyle Style, TDragAction Action) override;
  int Add(const TRect& Rect, const IPtr<IDragImage>& Image, TDesignBoxStyle Style,
          TDragAction Action) override;
  /// A box at the item's bounds, with no image.
  int Add(const IPtr<IItem2D>& Item, TDesignBoxStyle Style, TDragAction Action) override;
  /// Raises the drag-change counter, then erases and redraws one box. An index without a
  /// box is ignored (the counter still counts).
  void Change(int Index, const TRect& Rect, TDragAction Action) override;
  /// Erases all boxes, offsets them, draws them again: 2n draws.
  void MoveBy(int DX, int DY, TDragAction Action) override;
  /// Erases all boxes and forgets them; the arrays keep their length.
  void Done() override;
  /// Does nothing here.
  void CancelDrag() override {}

  /// Draws every box once, from index 0.
  void DrawBoxes();
  /// The union of all boxes; with none, (MaxInt, MaxInt, -MaxInt, -MaxInt).
  TRect BoundingRect() const;
  /// The number of boxes.
  int Used() const noexcept { return FUsed; }
  /// The length of the arrays (at least `Used`).
  int Capacity() const noexcept { return static_cast<int>(FRects.size()); }
  /// The box at `Index`, below `Used`.
  const TRect& BoxRect(int Index) const { return FRects.at(Index); }

protected:
  /// Draws (or, drawn again at the same place, erases) one box: the concrete class's part.
  virtual void DrawBox(const TRect& Rect, TDesignBoxStyle Style) = 0;
  /// Draws a box with an image; by default the outline alone.
  virtual void DrawBox(const TRect& Rect, const IPtr<IDragImage>& Image, TDesignBoxStyle Style);

private:
  std::vector<TRect> FRects;
  std::vector<TDesignBoxStyle> FKinds;
  std::vector<IPtr<IDragImage>> FImages;
  int FUsed = 0;
};

} // namespace formkit
