//===- frameworks/kiln/KilnToolBars.cpp - Tool bars ----------------------===//
#include "frameworks/kiln/KilnToolBars.h"

#include "frameworks/kiln/KilnActions.h"

namespace formkit {

FK_RESOURCESTRING(SInvalidButtonSize, "A tool bar button must be at least 1 pixel in size, not %d");

FK_IMPLEMENT(TToolBar, "KilnToolBars") {
  detail::PublishAlign(B);
  B.Property("ButtonHeight", &TToolBar::ButtonHeight, &TToolBar::SetButtonHeight).Default(22);
  B.Property("ButtonWidth", &TToolBar::ButtonWidth, &TToolBar::SetButtonWidth).Default(23);
  B.Property("ShowCaptions", &TToolBar::ShowCaptions, &TToolBar::SetShowCaptions).Default(false);
  B.Property("ShowHint", &TToolBar::ShowHint, &TToolBar::SetShowHint).Default(false);
  detail::PublishVisible(B);
}

void TToolBar::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csAcceptsControls, csClickEvents, csDoubleClicks});
  SetBounds(0, 0, 150, 30);
  SetAlign(alTop);
}

void TToolBar::SetButtonWidth(int Value) {
  if (Value < 1) throw EInvalidOperation(SInvalidButtonSize, Value);
  FButtonWidth = Value;
}

void TToolBar::SetButtonHeight(int Value) {
  if (Value < 1) throw EInvalidOperation(SInvalidButtonSize, Value);
  FButtonHeight = Value;
}

} // namespace formkit

namespace formkit {

//===----------------------------------------------------------------------===//
// TToolButton
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TToolButton, "KilnToolBars") {}

void TToolButton::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 23, 22);
}

void TToolButton::BeforeDestruction() {
  SetAction(nullptr);
  inherited::BeforeDestruction();
}

void TToolButton::SetAction(TAction* Value) {
  if (Value == FAction) return;
  if (FAction) RemoveFreeNotification(FAction);
  FAction = Value;
  if (Value) FreeNotification(Value);
}

String TToolButton::Caption() const { return FAction ? FAction->Caption() : String(); }
String TToolButton::Hint() const { return FAction ? FAction->Hint() : String(); }

bool TToolButton::ButtonEnabled() const {
  if (FStyle == tbsSeparator || FStyle == tbsDivider || !FAction) return false;
  FAction->Update();
  return FAction->Enabled();
}

void TToolButton::Click() {
  if (ButtonEnabled()) FAction->Execute();
  inherited::Click();
}

void TToolButton::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FAction) FAction = nullptr;
}

} // namespace formkit
