//===- frameworks/kiln/KilnCalendars.h - The month calendar ---------------===//
//
// A calendar that shows one month and lets a user pick a day. Headless: the
// date is a value, a key press and a double click are calls a test or a host
// makes, and the calendar answers the month-calendar message that asks for its
// smallest size, which follows its font: seven columns of three characters and
// a title, the day names and six weeks as rows.
//
// Example:
//   TMonthCalendar* C = CreateComponentOf<TMonthCalendar>(nullptr);
//   C->SetDate(EncodeDate(2024, 2, 29));
//   TRect R;
//   C->Perform(MCM_GETMINREQRECT, 0, reinterpret_cast<std::intptr_t>(&R));   // 1
//   C->KeyPress(Key);     // OnKeyPress sees the key and may change it
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

/// The first month-calendar message; `MCM_GETMINREQRECT` fills the `TRect` that LParam
/// points at with the smallest rectangle the calendar needs and answers 1.
inline constexpr std::uint32_t MCM_FIRST = 0x1000;
inline constexpr std::uint32_t MCM_GETMINREQRECT = MCM_FIRST + 9;

FK_EVENT(TKeyPressEvent, void(TObject* Sender, char& Key));

/// One month with a chosen day.
class FK_API TMonthCalendar : public TWinControl {
  FK_CLASS(TMonthCalendar, TWinControl)
  void Create(TComponent* AOwner) override;

  /// The chosen day (and time).
  TDateTime Date() const noexcept { return FDate; }
  void SetDate(TDateTime Value) noexcept { FDate = Value; }

  /// A key typed while the calendar has the focus: `OnKeyPress` sees it first.
  void KeyPress(char& Key);
  /// A double click on a day.
  void DblClick();
  TKeyPressEvent OnKeyPress;
  TNotifyEvent OnDblClick;

  void WndProc(TMessage& Message) override;

private:
  TDateTime FDate = 0;
};

} // namespace formkit
