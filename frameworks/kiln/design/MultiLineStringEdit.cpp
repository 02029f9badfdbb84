//===- frameworks/kiln/design/MultiLineStringEdit.cpp - A caption of several lines ===//
#include "frameworks/kiln/design/MultiLineStringEdit.h"

#include "frameworks/kiln/KilnWindows.h"
#include "platform/ScopeGuard.h"

namespace formkit {

TDialogPlacement& MultiLineStringEditDlgPlacement() noexcept {
  static TDialogPlacement Placement;
  return Placement;
}

//===----------------------------------------------------------------------===//
// TMultiLineStringEditDlg
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMultiLineStringEditDlg, "MultiLineStringEdit") {}

void TMultiLineStringEditDlg::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("MultiLineStringEditDlg");
  SetCaption(LoadResString(SMultiLineStringEditDlgCaption));
  SetBounds(0, 0, MinWidth, MinHeight);
  OnShow = TNotifyEvent::Bind<&TMultiLineStringEditDlg::FormShow>(this);

  auto Panel = [this](const char* Name, TAlign Align) {
    auto* P = CreateComponentOf<TPanel>(this);
    P->SetName(Name);
    P->SetCaption(String());
    P->SetParent(this);
    P->SetHeight(41);
    P->SetAlign(Align);
    return P;
  };
  pnBottom = Panel("pnBottom", alBottom);
  pnMain = Panel("pnMain", alClient);
  auto Button = [this](const char* Name, const char* Caption, TModalResult Result, int Left) {
    auto* B = CreateComponentOf<TButton>(this);
    B->SetName(Name);
    B->SetCaption(Caption);
    B->SetModalResult(Result);
    B->SetParent(pnBottom);
    B->SetBounds(Left, 8, 75, 25);
    return B;
  };
  OkButton = Button("OkButton", "&OK", mrOk, ClientWidth() - 166);
  OkButton->SetDefault(true);
  Cancel = Button("Cancel", "Cancel", mrCancel, ClientWidth() - 83);
  Cancel->SetCancel(true);

  CaptionEdit = CreateComponentOf<TMemo>(this);
  CaptionEdit->SetName("CaptionEdit");
  CaptionEdit->SetParent(pnMain);
  CaptionEdit->SetAlign(alClient);
  CaptionEdit->OnKeyDown = TKeyEvent::Bind<&TMultiLineStringEditDlg::CaptionEditKeyDown>(this);
}

void TMultiLineStringEditDlg::BeforeDestruction() {
  detail::StorePlacement(this, MultiLineStringEditDlgPlacement());
  inherited::BeforeDestruction();
}

void TMultiLineStringEditDlg::FormShow(TObject*) {
  FUpdatingPos = true;
  auto Done = Finally([this]() noexcept { FUpdatingPos = false; });
  detail::RestorePlacement(this, MultiLineStringEditDlgPlacement(), MinWidth, MinHeight);
}

void TMultiLineStringEditDlg::CaptionEditKeyDown(TObject*, std::uint16_t& Key, TShiftState) {
  if (Key != vkEscape) return;
  Cancel->Click();
  SetModalResult(Cancel->ModalResult());
}

//===----------------------------------------------------------------------===//
// TMultiLineStringProperty
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMultiLineStringProperty, "MultiLineStringEdit") {}

void TMultiLineStringProperty::Edit() {
  TObjectGuard<TMultiLineStringEditDlg> Dialog(CreateComponentOf<TMultiLineStringEditDlg>(Application()));
  Dialog->CaptionEdit->Lines()->SetText(GetStrValue());
  if (ShowModal(Dialog.Get()) != mrOk) return;
  String Text = Dialog->CaptionEdit->Lines()->Text();
  Text.erase(Text.find_last_not_of("\r\n") + 1);
  SetStrValue(Text);
}

} // namespace formkit
