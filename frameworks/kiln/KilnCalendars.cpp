//===- frameworks/kiln/KilnCalendars.cpp - The month calendar -------------===//
#include "frameworks/kiln/KilnCalendars.h"

namespace formkit {

FK_IMPLEMENT(TMonthCalendar, "KilnComCtrls") {
  B.Property("Date", &TMonthCalendar::Date, &TMonthCalendar::SetDate);
  B.Event("OnDblClick", &TMonthCalendar::OnDblClick);
  B.Event("OnKeyPress", &TMonthCalendar::OnKeyPress);
}

void TMonthCalendar::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 191, 154);
}

void TMonthCalendar::KeyPress(char& Key) {
  if (OnKeyPress && !IsDesigning()) OnKeyPress(this, Key);
}

void TMonthCalendar::DblClick() {
  if (OnDblClick && !IsDesigning()) OnDblClick(this);
}

void TMonthCalendar::WndProc(TMessage& Message) {
  if (Message.Msg != MCM_GETMINREQRECT) {
    inherited::WndProc(Message);
    return;
  }
  // Seven day columns of three characters with a character between them; a title row,
  // a row of day names and six weeks.
  const int Line = Font()->PixelHeight(CurrentPPI());
  const int Char = Line / 2;
  auto* R = reinterpret_cast<TRect*>(Message.LParam);
  *R = Rect(0, 0, 7 * 4 * Char + 2 * Char, 8 * (Line + 2) + 2);
  Message.Result = 1;
}

} // namespace formkit
