//===- frameworks/kiln/KilnExtCtrls.h - Panels and timers ----------------===//
//
// `TPanel` is a container with a bevelled edge: aligned children share the area
// inside its border and bevels. `TTimer` is a non-visual component; with no
// bounds of its own, its place on a design surface is its `DesignInfo`. Time is
// headless too: `AdvanceTimers` moves the clock and posts `WM_TIMER` to every
// timer that came due, and `ProcessMessages` runs their `OnTimer`.
//
// Example:
//   auto* Timer = CreateComponentOf<TTimer>(Form);
//   Timer->SetInterval(100);
//   Timer->OnTimer = TNotifyEvent::Bind<&TMyForm::Tick>(Form);
//   AdvanceTimers(250);      // two ticks queued
//   ProcessMessages();       // Tick runs twice
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

/// Moves the headless clock on by `Milliseconds` and posts one `WM_TIMER` for each
/// interval that every running timer completed. Raises `EInvalidOperation` for a
/// negative value.
FK_API void AdvanceTimers(int Milliseconds);

FK_ENUM(TBevelCut, std::uint8_t, bvNone, bvLowered, bvRaised, bvSpace)
FK_ENUM(TShapeType, std::uint8_t, stRectangle, stSquare, stRoundRect, stRoundSquare, stEllipse, stCircle)
FK_EVENT(TMouseEvent, void(TObject* Sender, TMouseButton Button, TShiftState Shift, int X, int Y));
FK_EVENT(TMouseMoveEvent, void(TObject* Sender, TShiftState Shift, int X, int Y));

/// A container: 185 by 41, accepts children, shows its caption in the middle.
class FK_API TPanel : public TCustomControl {
  FK_CLASS(TPanel, TCustomControl)
  void Create(TComponent* AOwner) override;

  TBevelCut BevelOuter() const noexcept { return FBevelOuter; }
  void SetBevelOuter(TBevelCut Value);
  TBevelCut BevelInner() const noexcept { return FBevelInner; }
  void SetBevelInner(TBevelCut Value);
  int BevelWidth() const noexcept { return FBevelWidth; }
  /// Raises `EInvalidOperation` for a width below 1.
  void SetBevelWidth(int Value);
  int BorderWidth() const noexcept { return FBorderWidth; }
  /// Raises `EInvalidOperation` for a negative width.
  void SetBorderWidth(int Value);
  /// The client area less the border and each bevel that is not `bvNone`.
  TRect AlignRect() const override;
  /// Fills the client area, frames each bevel and writes the caption in the middle.
  void Paint(TCanvas* Canvas) override;

private:
  TBevelCut FBevelOuter = bvRaised;
  TBevelCut FBevelInner = bvNone;
  int FBevelWidth = 1;
  int FBorderWidth = 0;
};

/// A filled figure: 65 by 65, a white rectangle with a black pen until set. It takes
/// the mouse as the window delivers it (`MouseDown`, `MouseMove`, `MouseUp`), in its own
/// client coordinates, and hands it to its events.
class FK_API TShape : public TGraphicControl {
  FK_CLASS(TShape, TGraphicControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The fill and the outline; owned.
  TBrush* Brush() const noexcept { return FBrush.Get(); }
  void SetBrush(TBrush* Value) { FBrush->Assign(Value); }
  TPen* Pen() const noexcept { return FPen.Get(); }
  void SetPen(TPen* Value) { FPen->Assign(Value); }
  TShapeType Shape() const noexcept { return FShape; }
  void SetShape(TShapeType Value) noexcept { FShape = Value; }
  /// Fills and frames the figure: an ellipse for the round kinds, else a rectangle.
  void Paint(TCanvas* Canvas) override;

  // Input -----------------------------------------------------------------
  void MouseDown(TMouseButton Button, TShiftState Shift, int X, int Y);
  void MouseMove(TShiftState Shift, int X, int Y);
  void MouseUp(TMouseButton Button, TShiftState Shift, int X, int Y);
  TMouseEvent OnMouseDown;
  TMouseMoveEvent OnMouseMove;
  TMouseEvent OnMouseUp;

private:
  TObjectGuard<TBrush> FBrush;
  TObjectGuard<TPen> FPen;
  TShapeType FShape = stRectangle;
};

/// A non-visual component that calls `OnTimer` every `Interval` milliseconds of the
/// headless clock while it is enabled.
class FK_API TTimer : public TComponent, public TMessageTarget {
  FK_CLASS(TTimer, TComponent)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  bool Enabled() const noexcept { return FEnabled; }
  /// Turning the timer on or off restarts its interval.
  void SetEnabled(bool Value);
  int Interval() const noexcept { return FInterval; }
  /// Restarts the interval; 0 stops the ticks. Raises `EInvalidOperation` for a negative value.
  void SetInterval(int Value);
  TNotifyEvent OnTimer;
  /// Runs `OnTimer` on `WM_TIMER`, except on a design surface.
  void WndProc(TMessage& Message) override;

private:
  friend void AdvanceTimers(int Milliseconds);
  bool FEnabled = true;
  int FInterval = 1000;
  long long FElapsed = 0;
};

} // namespace formkit
