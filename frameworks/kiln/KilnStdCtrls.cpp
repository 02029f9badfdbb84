//===- frameworks/kiln/KilnStdCtrls.cpp - Buttons, labels, edits, check boxes ===//
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit {

FK_RESOURCESTRING(SInvalidMaxLength, "Maximum length %d is not valid: it must be 0 or more");
FK_RESOURCESTRING(SGrayedNotAllowed, "Check box '%s' does not allow the grayed state");

//===----------------------------------------------------------------------===//
// TButton
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TButton, "KilnStdCtrls") {
  detail::PublishAlign(B);
  B.Property("Cancel", &TButton::Cancel, &TButton::SetCancel).Default(false);
  detail::PublishCaption(B);
  B.Property("Default", &TButton::Default, &TButton::SetDefault).Default(false);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  B.Property("ModalResult", &TButton::ModalResult, &TButton::SetModalResult).Default(0);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TButton::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csSetCaption, csDoubleClicks, csClickEvents, csOpaque});
  SetTabStop(true);
  SetBounds(0, 0, 75, 25);
}

//===----------------------------------------------------------------------===//
// TLabel
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TLabel, "KilnStdCtrls") {
  detail::PublishAlign(B);
  detail::PublishCaption(B);
  detail::PublishColor(B, clBtnFace);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  B.Property("Transparent", &TLabel::Transparent, &TLabel::SetTransparent).Default(false);
  B.Property("WordWrap", &TLabel::WordWrap, &TLabel::SetWordWrap).Default(false);
  B.Property("FocusControl", &TLabel::FocusControl, &TLabel::SetFocusControl);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TLabel::SetFocusControl(TWinControl* Value) {
  if (Value == FFocusControl) return;
  // The link is kept both ways across owners, so either side may go first.
  if (FFocusControl) RemoveFreeNotification(FFocusControl);
  FFocusControl = Value;
  if (Value) FreeNotification(Value);
}

void TLabel::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FFocusControl) FFocusControl = nullptr;
}

void TLabel::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csSetCaption, csClickEvents, csDoubleClicks, csReplicatable});
  SetBounds(0, 0, 65, 17);
}

void TLabel::Paint(TCanvas* Canvas) {
  if (!FTransparent) {
    Canvas->Brush()->SetColor(Color());
    Canvas->FillRect(ClientRect());
  }
  Canvas->Font()->Assign(Font());
  Canvas->TextOut(0, 0, Caption());
}

//===----------------------------------------------------------------------===//
// TEdit
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TEdit, "KilnStdCtrls") {
  detail::PublishAlign(B);
  detail::PublishColor(B, clWindow);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  B.Property("MaxLength", &TEdit::MaxLength, &TEdit::SetMaxLength).Default(0);
  B.Property("ReadOnly", &TEdit::ReadOnly, &TEdit::SetReadOnly).Default(false);
  detail::PublishTabOrder(B);
  detail::PublishText(B);
  detail::PublishVisible(B);
  B.Event("OnChange", &TEdit::OnChange);
  detail::PublishOnClick(B);
}

void TEdit::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csSetCaption, csClickEvents, csDoubleClicks, csOpaque});
  SetColor(clWindow);
  SetTabStop(true);
  SetBounds(0, 0, 121, 23);
}

void TEdit::SetMaxLength(int Value) {
  if (Value < 0) throw EInvalidOperation(SInvalidMaxLength, Value);
  FMaxLength = Value;
}

void TEdit::TextChanged() {
  inherited::TextChanged();
  if (OnChange && !IsDesigning() && !IsLoading()) OnChange(this);
}

//===----------------------------------------------------------------------===//
// TCheckBox
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCheckBox, "KilnStdCtrls") {
  detail::PublishAlign(B);
  B.Property("AllowGrayed", &TCheckBox::AllowGrayed, &TCheckBox::SetAllowGrayed).Default(false);
  detail::PublishCaption(B);
  B.Property("Checked", &TCheckBox::Checked, &TCheckBox::SetChecked)
      .Default(false)
      .Stored(+[](TObject* O) { return static_cast<TCheckBox*>(O)->State() != cbGrayed; });
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  B.Property("State", &TCheckBox::State, &TCheckBox::SetState)
      .Default(cbUnchecked)
      .Stored(+[](TObject* O) { return static_cast<TCheckBox*>(O)->State() == cbGrayed; });
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TCheckBox::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csSetCaption, csDoubleClicks, csClickEvents});
  SetTabStop(true);
  SetBounds(0, 0, 97, 19);
}

void TCheckBox::SetState(TCheckBoxState Value) {
  if (Value == cbGrayed && !FAllowGrayed) throw EInvalidOperation(SGrayedNotAllowed, Name());
  if (FState == Value) return;
  FState = Value;
  // A change of state is a click, except while a stream sets it.
  if (!IsLoading()) Click();
}

void TCheckBox::SetAllowGrayed(bool Value) {
  FAllowGrayed = Value;
  if (!Value && FState == cbGrayed) SetState(cbUnchecked);
}

void TCheckBox::Toggle() {
  switch (FState) {
  case cbUnchecked: SetState(FAllowGrayed ? cbGrayed : cbChecked); break;
  case cbChecked: SetState(cbUnchecked); break;
  case cbGrayed: SetState(cbChecked); break;
  }
}

} // namespace formkit
