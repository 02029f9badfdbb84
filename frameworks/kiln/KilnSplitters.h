//===- frameworks/kiln/KilnSplitters.h - Splitters -----------------------===//
//
// A splitter is a thin bar aligned beside another aligned control; dragging it
// resizes that control. `OnCanResize` may change the new size or refuse it,
// `OnMoved` follows a resize. `MoveTo` is the drag: the bar's new edge in its
// parent's client coordinates, as a mouse release would leave it.
//
// Example:
//   auto* Bar = CreateComponentOf<TSplitter>(Form);
//   Bar->SetAlign(alTop);
//   Bar->SetParent(Form);                 // below an aligned-top tool bar
//   Bar->MoveTo(60);                      // the tool bar is now 60 pixels high
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

FK_ENUM(TResizeStyle, std::uint8_t, rsNone, rsLine, rsUpdate, rsPattern)
FK_EVENT(TCanResizeEvent, void(TObject* Sender, int& NewSize, bool& Accept));

/// A bar that resizes the aligned control before it.
class FK_API TSplitter : public TGraphicControl {
  FK_CLASS(TSplitter, TGraphicControl)
  /// Aligned left, 3 pixels wide, a minimum size of 30.
  void Create(TComponent* AOwner) override;

  int MinSize() const noexcept { return FMinSize; }
  void SetMinSize(int Value) noexcept { FMinSize = Value; }
  TResizeStyle ResizeStyle() const noexcept { return FResizeStyle; }
  void SetResizeStyle(TResizeStyle Value) noexcept { FResizeStyle = Value; }

  /// The visible sibling with the same alignment whose edge touches the splitter: the
  /// control a drag resizes. Null when there is none.
  TControl* ResizeControl() const;
  /// Drags the splitter's leading edge (top for `alTop`, left for `alLeft`, bottom for
  /// `alBottom`, right for `alRight`) to `Position`: the control before it takes the size
  /// that gives, at least `MinSize`, as `OnCanResize` lets it. False when nothing moved.
  bool MoveTo(int Position);

  TCanResizeEvent OnCanResize;
  TNotifyEvent OnMoved;

private:
  int FMinSize = 30;
  TResizeStyle FResizeStyle = rsPattern;
};

} // namespace formkit
