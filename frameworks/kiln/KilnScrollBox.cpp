//===- frameworks/kiln/KilnScrollBox.cpp - Scrolling windowed controls ---===//
#include "frameworks/kiln/KilnScrollBox.h"

#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TControlScrollBar, "KilnForms") {}
FK_IMPLEMENT(TScrollingWinControl, "KilnForms") {}
FK_IMPLEMENT(TScrollBox, "KilnForms") {
  detail::PublishColor(B, clBtnFace);
  detail::PublishVisible(B, true);
}

//===----------------------------------------------------------------------===//
// TControlScrollBar
//===----------------------------------------------------------------------===//

int TControlScrollBar::Range() const {
  if (FControl) FControl->UpdateScrollRanges();
  return FRange;
}

int TControlScrollBar::Position() const {
  if (FControl) FControl->UpdateScrollRanges();
  return FPosition;
}

int TControlScrollBar::MaxPosition() const {
  if (FControl) FControl->UpdateScrollRanges();
  int Extent = !FControl ? 0 : FKind == sbHorizontal ? FControl->ClientWidth() : FControl->ClientHeight();
  return std::max(0, FRange - Extent);
}

void TControlScrollBar::SetRange(int Value) {
  if (FControl) FControl->FAutoScroll = false;
  ApplyRange(Value);
}

void TControlScrollBar::ApplyRange(int Value) {
  FRange = std::max(Value, 0);
  SetPosition(FPosition);
}

void TControlScrollBar::SetPosition(int Value) {
  Value = std::clamp(Value, 0, MaxPosition());
  if (Value == FPosition) return;
  int Delta = FPosition - Value;
  FPosition = Value;
  if (!FControl) return;
  if (FKind == sbHorizontal) FControl->ScrollBy(Delta, 0);
  else FControl->ScrollBy(0, Delta);
}

//===----------------------------------------------------------------------===//
// TScrollingWinControl
//===----------------------------------------------------------------------===//

void TScrollingWinControl::Create(TComponent* AOwner) {
  FHorzScrollBar.Reset(new TControlScrollBar(this, sbHorizontal));
  FVertScrollBar.Reset(new TControlScrollBar(this, sbVertical));
  inherited::Create(AOwner);
}

void TScrollingWinControl::BeforeDestruction() {
  inherited::BeforeDestruction();
  FHorzScrollBar.Reset();
  FVertScrollBar.Reset();
}

void TScrollingWinControl::ScrollBy(int DeltaX, int DeltaY) {
  if (DeltaX == 0 && DeltaY == 0) return;
  DisableAlign();
  for (int I = 0; I < ControlCount(); ++I) {
    TControl* C = Controls(I);
    C->SetBounds(C->Left() + DeltaX, C->Top() + DeltaY, C->Width(), C->Height());
  }
  EnableAlign();
}

void TScrollingWinControl::EnableAutoRange() {
  if (FAutoRangeLevel > 0 && --FAutoRangeLevel == 0) FRangesStale = true;
}

void TScrollingWinControl::SetAutoScroll(bool Value) {
  FAutoScroll = Value;
  FRangesStale = true;
}

void TScrollingWinControl::Resized() {
  inherited::Resized();
  FRangesStale = true;
}

void TScrollingWinControl::ControlChange(TControl* Child, bool Inserting) {
  inherited::ControlChange(Child, Inserting);
  FRangesStale = true;
}

void TScrollingWinControl::UpdateScrollRanges() const {
  if (!FRangesStale || FUpdatingRanges || !FAutoScroll || !AutoRangeEnabled() || !FHorzScrollBar || !FVertScrollBar)
    return;
  FRangesStale = false;
  FUpdatingRanges = true; // applying a range moves children, which must not recompute it
  auto Done = Finally([this]() noexcept { FUpdatingRanges = false; });
  // The extent in scrolled coordinates: a child at client X stands at X + position.
  int Right = 0, Bottom = 0;
  for (int I = 0; I < ControlCount(); ++I) {
    TControl* C = Controls(I);
    if (C->Align() != alNone) continue; // aligned children fill the client area, never beyond
    Right = std::max(Right, C->Left() + C->Width() + FHorzScrollBar->FPosition);
    Bottom = std::max(Bottom, C->Top() + C->Height() + FVertScrollBar->FPosition);
  }
  FHorzScrollBar->ApplyRange(Right > 0 ? Right + FHorzScrollBar->Margin() : 0);
  FVertScrollBar->ApplyRange(Bottom > 0 ? Bottom + FVertScrollBar->Margin() : 0);
}

//===----------------------------------------------------------------------===//
// TScrollBox
//===----------------------------------------------------------------------===//

void TScrollBox::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csAcceptsControls, csCaptureMouse, csClickEvents, csSetCaption, csDoubleClicks});
  SetBounds(0, 0, 185, 41);
}

} // namespace formkit
