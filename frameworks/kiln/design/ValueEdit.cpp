//===- frameworks/kiln/design/ValueEdit.cpp - Name and value lists in a dialog ===//
#include "frameworks/kiln/design/ValueEdit.h"

#include "frameworks/kiln/KilnWindows.h"

namespace formkit {

FK_IMPLEMENT(TValueEditDlg, "ValueEdit") {}

void TValueEditDlg::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("ValueEditDlg");
  SetCaption(LoadResString(SValueEditDlgCaption));
  SetHelpContext(26005);
  ValueListEditor1 = CreateComponentOf<TValueListEditor>(this);
  ValueListEditor1->SetName("ValueListEditor1");
  ValueListEditor1->SetParent(this);
  ValueListEditor1->SetAlign(alClient);
  ValueListEditor1->SetKeyOptions({keyEdit, keyAdd, keyDelete});
  ValueListEditor1->SetColWidth(0, 150);
  ValueListEditor1->SetColWidth(1, 249);
  ValueListEditor1->OnStringsChange = TNotifyEvent::Bind<&TValueEditDlg::ValueListEditor1StringsChange>(this);
  ValueListEditor1->OnKeyDown = TKeyEvent::Bind<&TValueEditDlg::ValueListEditor1KeyDown>(this);
}

void TValueEditDlg::ValueListEditor1StringsChange(TObject* Sender) {
  if (Sender == ValueListEditor1) FModified = true;
}

void TValueEditDlg::ValueListEditor1KeyDown(TObject*, std::uint16_t& Key, TShiftState) { CancelOnEscape(Key); }

FK_IMPLEMENT(TValueListProperty, "ValueEdit") {}

TStrEditDlg* TValueListProperty::EditDialog() { return CreateComponentOf<TValueEditDlg>(Application()); }

} // namespace formkit
