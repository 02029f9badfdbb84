//===- frameworks/kiln/KilnScrollBox.h - Scrolling windowed controls -----===//
//
// A windowed control whose children lie on an area larger than its client
// area: two scroll bars say how far the area reaches (`Range`) and which part
// is on show (`Position`). Moving a scroll bar moves the children the other
// way, so that a child's bounds stay in client coordinates. Forms scroll too;
// `TScrollBox` is the plain scrolling container.
//
// Example:
//   auto* Box = CreateComponentOf<TScrollBox>(Form);
//   Box->SetParent(Form);
//   Box->VertScrollBar()->SetRange(1000);
//   Box->VertScrollBar()->SetPosition(200);   // every child moves up by 200
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

class TScrollingWinControl;

FK_ENUM(TScrollBarKind, std::uint8_t, sbHorizontal, sbVertical)

/// One scroll bar of a scrolling control. Owned by the control.
class FK_API TControlScrollBar : public TPersistent {
  FK_CLASS(TControlScrollBar, TPersistent)
  TControlScrollBar() = default;
  TControlScrollBar(TScrollingWinControl* Control, TScrollBarKind Kind) : FControl(Control), FKind(Kind) {}

  TScrollBarKind Kind() const noexcept { return FKind; }
  /// How far the scrolled area reaches, from 0; 0 means nothing to scroll.
  int Range() const;
  /// Takes a new range (negative counts as 0) and pulls the position back into it. A
  /// range set from outside turns the control's automatic range off.
  void SetRange(int Value);
  /// The first pixel of the area on show.
  int Position() const;
  /// Clamped to 0 .. `Range` less the client extent (0 when that is negative); the
  /// children move by the difference.
  void SetPosition(int Value);
  /// The last position the range allows.
  int MaxPosition() const;
  /// The space kept free beyond the last child when the range is computed.
  int Margin() const noexcept { return FMargin; }
  void SetMargin(int Value) noexcept { FMargin = Value < 0 ? 0 : Value; }
  /// Whether the area follows the thumb while it is dragged.
  bool Tracking() const noexcept { return FTracking; }
  void SetTracking(bool Value) noexcept { FTracking = Value; }
  bool Visible() const noexcept { return FVisible; }
  void SetVisible(bool Value) noexcept { FVisible = Value; }

private:
  friend class TScrollingWinControl;
  /// Takes the range without touching the automatic range.
  void ApplyRange(int Value);
  TScrollingWinControl* FControl = nullptr; // the control that owns this bar
  TScrollBarKind FKind = sbHorizontal;
  int FRange = 0;
  int FPosition = 0;
  int FMargin = 0;
  bool FTracking = false;
  bool FVisible = true;
};

/// A windowed control with two scroll bars. While the automatic range is on, the range
/// of each bar follows the children's extent (plus the bar's margin). It is computed when
/// a bar is next asked, not at each change, so that adding many children stays linear.
class FK_API TScrollingWinControl : public TWinControl {
  FK_CLASS(TScrollingWinControl, TWinControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The bars; owned by the control.
  TControlScrollBar* HorzScrollBar() const noexcept { return FHorzScrollBar.Get(); }
  TControlScrollBar* VertScrollBar() const noexcept { return FVertScrollBar.Get(); }
  /// Moves every child by (`DeltaX`, `DeltaY`).
  void ScrollBy(int DeltaX, int DeltaY);
  /// Stops the ranges from following the children, until the matching `EnableAutoRange`.
  void DisableAutoRange() noexcept { ++FAutoRangeLevel; }
  /// Lets the ranges follow the children again, and brings them up to date.
  void EnableAutoRange();
  bool AutoRangeEnabled() const noexcept { return FAutoRangeLevel == 0; }
  /// Whether the ranges follow the children (true by default).
  bool AutoScroll() const noexcept { return FAutoScroll; }
  void SetAutoScroll(bool Value);

protected:
  void Resized() override;
  void ControlChange(TControl* Child, bool Inserting) override;

private:
  friend class TControlScrollBar;
  /// Computes each range from the children's extent, if it is due and allowed.
  void UpdateScrollRanges() const;
  TObjectGuard<TControlScrollBar> FHorzScrollBar;
  TObjectGuard<TControlScrollBar> FVertScrollBar;
  int FAutoRangeLevel = 0;
  bool FAutoScroll = true;
  mutable bool FRangesStale = false;
  mutable bool FUpdatingRanges = false;
};

/// A plain scrolling container: 185 by 41, accepts children.
class FK_API TScrollBox : public TScrollingWinControl {
  FK_CLASS(TScrollBox, TScrollingWinControl)
  void Create(TComponent* AOwner) override;
};

} // namespace formkit
