//===- frameworks/kiln/KilnExtCtrls.cpp - Panels and timers --------------===//
#include "frameworks/kiln/KilnExtCtrls.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SInvalidBevelWidth, "Bevel width %d is not valid: it must be at least 1");
FK_RESOURCESTRING(SInvalidBorderWidth, "Border width %d is not valid: it must be 0 or more");
FK_RESOURCESTRING(SInvalidInterval, "Timer interval %d is not valid: it must be 0 or more");
FK_RESOURCESTRING(SInvalidTimeStep, "The clock cannot go back (%d milliseconds)");

//===----------------------------------------------------------------------===//
// TPanel
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TShape, "KilnExtCtrls") {
  detail::PublishAlign(B);
  B.Property("Brush", &TShape::Brush, &TShape::SetBrush);
  B.Property("Pen", &TShape::Pen, &TShape::SetPen);
  B.Property("Shape", &TShape::Shape, &TShape::SetShape).Default(stRectangle);
  detail::PublishVisible(B);
  B.Event("OnMouseDown", &TShape::OnMouseDown);
  B.Event("OnMouseMove", &TShape::OnMouseMove);
  B.Event("OnMouseUp", &TShape::OnMouseUp);
}

void TShape::Create(TComponent* AOwner) {
  FBrush.Reset(new TBrush);
  FPen.Reset(new TPen);
  inherited::Create(AOwner);
  SetBounds(0, 0, 65, 65);
}

void TShape::BeforeDestruction() {
  inherited::BeforeDestruction();
  FBrush.Reset();
  FPen.Reset();
}

void TShape::Paint(TCanvas* Canvas) {
  Canvas->Brush()->Assign(FBrush.Get());
  Canvas->Pen()->Assign(FPen.Get());
  TRect R = ClientRect();
  bool Round = FShape == stEllipse || FShape == stCircle || FShape == stRoundRect || FShape == stRoundSquare;
  if (Round) Canvas->Ellipse(R.Left, R.Top, R.Right, R.Bottom);
  else Canvas->Rectangle(R);
}

void TShape::MouseDown(TMouseButton Button, TShiftState Shift, int X, int Y) {
  if (OnMouseDown) OnMouseDown(this, Button, Shift, X, Y);
}

void TShape::MouseMove(TShiftState Shift, int X, int Y) {
  if (OnMouseMove) OnMouseMove(this, Shift, X, Y);
}

void TShape::MouseUp(TMouseButton Button, TShiftState Shift, int X, int Y) {
  if (OnMouseUp) OnMouseUp(this, Button, Shift, X, Y);
}

FK_IMPLEMENT(TPanel, "KilnExtCtrls") {
  detail::PublishAlign(B);
  B.Property("BevelInner", &TPanel::BevelInner, &TPanel::SetBevelInner).Default(bvNone);
  B.Property("BevelOuter", &TPanel::BevelOuter, &TPanel::SetBevelOuter).Default(bvRaised);
  B.Property("BevelWidth", &TPanel::BevelWidth, &TPanel::SetBevelWidth).Default(1);
  B.Property("BorderWidth", &TPanel::BorderWidth, &TPanel::SetBorderWidth).Default(0);
  detail::PublishCaption(B);
  detail::PublishColor(B, clBtnFace);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TPanel::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csAcceptsControls, csCaptureMouse, csClickEvents, csSetCaption, csOpaque, csDoubleClicks,
                   csReplicatable});
  SetBounds(0, 0, 185, 41);
}

void TPanel::SetBevelOuter(TBevelCut Value) {
  if (FBevelOuter == Value) return;
  FBevelOuter = Value;
  Realign();
}

void TPanel::SetBevelInner(TBevelCut Value) {
  if (FBevelInner == Value) return;
  FBevelInner = Value;
  Realign();
}

void TPanel::SetBevelWidth(int Value) {
  if (Value < 1) throw EInvalidOperation(SInvalidBevelWidth, Value);
  if (FBevelWidth == Value) return;
  FBevelWidth = Value;
  Realign();
}

void TPanel::SetBorderWidth(int Value) {
  if (Value < 0) throw EInvalidOperation(SInvalidBorderWidth, Value);
  if (FBorderWidth == Value) return;
  FBorderWidth = Value;
  Realign();
}

TRect TPanel::AlignRect() const {
  int Inset = FBorderWidth;
  if (FBevelOuter != bvNone) Inset += FBevelWidth;
  if (FBevelInner != bvNone) Inset += FBevelWidth;
  TRect R = ClientRect();
  R = Rect(R.Left + Inset, R.Top + Inset, std::max(R.Right - Inset, R.Left + Inset),
           std::max(R.Bottom - Inset, R.Top + Inset));
  return R;
}

void TPanel::Paint(TCanvas* Canvas) {
  inherited::Paint(Canvas);
  TRect R = ClientRect();
  auto Frame = [&](TBevelCut Cut) {
    if (Cut == bvNone) return;
    for (int I = 0; I < FBevelWidth; ++I) {
      Canvas->FrameRect(R);
      R = Rect(R.Left + 1, R.Top + 1, R.Right - 1, R.Bottom - 1);
    }
  };
  Frame(FBevelOuter);
  R = Rect(R.Left + FBorderWidth, R.Top + FBorderWidth, R.Right - FBorderWidth, R.Bottom - FBorderWidth);
  Frame(FBevelInner);
  if (Caption().empty()) return;
  Canvas->Font()->Assign(Font());
  TPoint Size = Canvas->TextExtent(Caption());
  Canvas->TextOut((ClientWidth() - Size.X) / 2, (ClientHeight() - Size.Y) / 2, Caption());
}

//===----------------------------------------------------------------------===//
// TTimer
//===----------------------------------------------------------------------===//

namespace {
/// The live timers, for the clock. Immortal, like the message queue.
std::vector<TTimer*>& Timers() {
  static auto* L = new std::vector<TTimer*>;
  return *L;
}
} // namespace

FK_IMPLEMENT(TTimer, "KilnExtCtrls") {
  B.Property("Enabled", &TTimer::Enabled, &TTimer::SetEnabled).Default(true);
  B.Property("Interval", &TTimer::Interval, &TTimer::SetInterval).Default(1000);
  B.Event("OnTimer", &TTimer::OnTimer);
}

void TTimer::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  Timers().push_back(this);
}

void TTimer::BeforeDestruction() {
  std::erase(Timers(), this);
  RemoveMessages(this);
  inherited::BeforeDestruction();
}

void TTimer::SetEnabled(bool Value) {
  if (FEnabled == Value) return;
  FEnabled = Value;
  FElapsed = 0;
}

void TTimer::SetInterval(int Value) {
  if (Value < 0) throw EInvalidOperation(SInvalidInterval, Value);
  FInterval = Value;
  FElapsed = 0;
}

void TTimer::WndProc(TMessage& Message) {
  if (Message.Msg == WM_TIMER && OnTimer && !IsDesigning()) OnTimer(this);
}

void AdvanceTimers(int Milliseconds) {
  if (Milliseconds < 0) throw EInvalidOperation(SInvalidTimeStep, Milliseconds);
  for (TTimer* T : std::vector<TTimer*>(Timers())) {
    if (!T->FEnabled || T->FInterval <= 0) continue;
    T->FElapsed += Milliseconds;
    while (T->FElapsed >= T->FInterval) {
      T->FElapsed -= T->FInterval;
      PostMessage(T, WM_TIMER, 0, 0);
    }
  }
}

} // namespace formkit
