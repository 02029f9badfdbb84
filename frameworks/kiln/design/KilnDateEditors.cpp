//===- frameworks/kiln/design/KilnDateEditors.cpp - Dates with a calendar drop-down ===//
#include "frameworks/kiln/design/KilnEditors.h"

namespace formkit {

FK_IMPLEMENT(KilnEditors::TMonthCalendar, "KilnEditors") {}
FK_IMPLEMENT(KilnEditors::TDateProperty, "KilnEditors") {}

namespace KilnEditors {

namespace {
constexpr char EnterKey = 13;
constexpr char EscapeKey = 27;
} // namespace

void TDateProperty::BeforeDestruction() {
  FControl.Reset();
  FHost = nullptr;
  inherited::BeforeDestruction();
}

TPropertyAttributes TDateProperty::GetAttributes() {
  return inherited::GetAttributes() + TPropertyAttributes{paCustomDropDown};
}

void TDateProperty::Edit(const IPtr<IPropertyHost>& Host, bool) {
  FControl.Reset();
  FControl.Reset(CreateComponentOf<TMonthCalendar>(nullptr));
  FControl->OnKeyPress = TKeyPressEvent::Bind<&TDateProperty::CalendarKeyPress>(this);
  FControl->OnDblClick = TNotifyEvent::Bind<&TDateProperty::CalendarDblClick>(this);
  FControl->SetAlign(alNone);
  FControl->SetVisible(false);
  TRect Smallest;
  FControl->Perform(MCM_GETMINREQRECT, 0, reinterpret_cast<std::intptr_t>(&Smallest));
  FControl->SetVisible(true);
  FControl->SetWidth(Smallest.Right);
  FControl->SetHeight(Smallest.Bottom);
  const double Value = GetFloatValue();
  FControl->SetDate(Value != 0 ? Value : Now());
  FHost = Host.Get();
  Host->DropDownControl(FControl.Get());
}

void TDateProperty::CalendarDblClick(TObject*) { SetFloatValue(FControl->Date()); }

void TDateProperty::CalendarKeyPress(TObject*, char& Key) {
  if (Key == EnterKey) SetFloatValue(FControl->Date());
  else if (Key == EscapeKey && FHost) FHost->CloseDropDown();
}

} // namespace KilnEditors

} // namespace formkit
