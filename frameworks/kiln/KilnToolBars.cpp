//===- frameworks/kiln/KilnToolBars.cpp - Tool bars ----------------------===//
#include "frameworks/kiln/KilnToolBars.h"

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
