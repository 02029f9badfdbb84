//===- frameworks/kiln/Kiln.cpp - Starting and stopping the framework ----===//
#include "frameworks/kiln/Kiln.h"

namespace formkit {

namespace detail {
int KilnStarts = 0;
TClass GroupBeforeKiln = nullptr;

std::vector<TClass> KilnClasses() {
  return {TControl::StaticClass(),     TWinControl::StaticClass(), TGraphicControl::StaticClass(),
          TCustomControl::StaticClass(), TCustomForm::StaticClass(), TForm::StaticClass(),
          TCustomFrame::StaticClass(), TFrame::StaticClass(),      TDataModule::StaticClass(),
          TButton::StaticClass(),      TLabel::StaticClass(),      TEdit::StaticClass(),
          TCheckBox::StaticClass(),    TPanel::StaticClass(),      TTimer::StaticClass()};
}
} // namespace detail

void InitializeKiln() {
  if (detail::KilnStarts++ > 0) return;
  try {
    // The group first: a class joins the group it belongs to when it is registered.
    StartClassGroup(TControl::StaticClass());
    GroupDescendentsWith(TDataModule::StaticClass(), TControl::StaticClass());
    GroupDescendentsWith(TTimer::StaticClass(), TControl::StaticClass());
    for (TClass C : detail::KilnClasses()) RegisterClass(C);
    detail::GroupBeforeKiln = ActivateClassGroup(TControl::StaticClass());
  } catch (...) {
    for (TClass C : detail::KilnClasses()) UnRegisterClass(C);
    --detail::KilnStarts;
    throw;
  }
}

void FinalizeKiln() {
  if (detail::KilnStarts == 0 || --detail::KilnStarts > 0) return;
  for (TClass C : detail::KilnClasses()) UnRegisterClass(C);
  if (detail::GroupBeforeKiln) ActivateClassGroup(detail::GroupBeforeKiln);
  detail::GroupBeforeKiln = nullptr;
  detail::FreeClipboard();
  if (Screen()->FormCount() == 0) detail::FreeScreen();
}

bool KilnInitialized() noexcept { return detail::KilnStarts > 0; }

} // namespace formkit
