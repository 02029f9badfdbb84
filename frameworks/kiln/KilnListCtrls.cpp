//===- frameworks/kiln/KilnListCtrls.cpp - Choices: radio buttons and lists ===//
#include "frameworks/kiln/KilnListCtrls.h"

#include "platform/Classes.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// TRadioButton
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TRadioButton, "KilnListCtrls") {
  detail::PublishCaption(B);
  B.Property("Checked", &TRadioButton::Checked, &TRadioButton::SetChecked).Default(false);
  detail::PublishEnabled(B);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TRadioButton::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csSetCaption, csDoubleClicks, csClickEvents});
  SetTabStop(true);
  SetBounds(0, 0, 113, 17);
}

void TRadioButton::SetChecked(bool Value) {
  if (FChecked == Value) return;
  FChecked = Value;
  if (!Value) return;
  if (TWinControl* Group = Parent())
    for (int I = 0; I < Group->ControlCount(); ++I)
      if (auto* Other = dynamic_cast<TRadioButton*>(Group->Controls(I)); Other && Other != this) Other->FChecked = false;
  if (!IsLoading()) Click();
}

//===----------------------------------------------------------------------===//
// TCustomListControl, TComboBox, TListBox
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCustomListControl, "KilnListCtrls") {}

void TCustomListControl::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FItems.Reset(new TStringList);
  SetTabStop(true);
}

void TCustomListControl::BeforeDestruction() {
  FItems.Reset();
  inherited::BeforeDestruction();
}

void TCustomListControl::SetItemIndex(int Value) {
  if (Value < -1 || Value >= FItems->Count()) throw EListError(SListIndexError, Value);
  if (FItemIndex == Value) return;
  FItemIndex = Value;
  if (OnChange && !IsDesigning() && !IsLoading()) OnChange(this);
}

FK_IMPLEMENT(TComboBox, "KilnListCtrls") {
  detail::PublishEnabled(B);
  B.Property("Style", &TComboBox::Style, &TComboBox::SetStyle).Default(csDropDown);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
}

void TComboBox::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 145, 23);
}

String TComboBox::Text() const {
  if (FItemIndex >= 0 && FItemIndex < FItems->Count()) return FItems->Get(FItemIndex);
  return FStyle == csDropDownList ? String() : Caption();
}

void TComboBox::SetItemIndex(int Value) {
  inherited::SetItemIndex(Value);
  if (FStyle != csDropDownList && Value >= 0) SetCaption(FItems->Get(Value));
}

FK_IMPLEMENT(TListBox, "KilnListCtrls") {
  detail::PublishEnabled(B);
  B.Property("Sorted", &TListBox::Sorted, &TListBox::SetSorted).Default(false);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
}

void TListBox::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 121, 97);
}

//===----------------------------------------------------------------------===//
// TBevel
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBevel, "KilnListCtrls") {
  B.Property("Shape", &TBevel::Shape, &TBevel::SetShape).Default(bsBox);
  detail::PublishVisible(B);
}

void TBevel::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 50, 50);
}

} // namespace formkit
