//===- frameworks/kiln/design/StringsEdit.cpp - The string list dialog ----===//
#include "frameworks/kiln/design/StringsEdit.h"

namespace formkit {

FK_IMPLEMENT(TStringsEditDlg, "StringsEdit") {}

void TStringsEditDlg::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("StringsEditDlg");
  SetHelpContext(26000);
  SingleLine = LoadResString(srLine);
  MultipleLines = LoadResString(srLines);
  Column = LoadResString(srColumn);

  StatusBar = CreateComponentOf<TStatusBar>(this);
  StatusBar->SetName("StatusBar");
  StatusBar->SetParent(this);
  StatusBar->SetAlign(alBottom);
  for (int Width : {100, 100, 200}) StatusBar->Panels()->Add()->SetWidth(Width);

  Memo = CreateComponentOf<TMemo>(this);
  Memo->SetName("Memo");
  Memo->SetParent(this);
  Memo->SetAlign(alClient);
  Memo->SetWordWrap(false);
  Memo->SetScrollBars(ssBoth);
  Memo->Font()->SetName("Tahoma");
  Memo->OnChange = TNotifyEvent::Bind<&TStringsEditDlg::UpdateStatus>(this);
  Memo->OnSelectionChange = TNotifyEvent::Bind<&TStringsEditDlg::UpdateStatus>(this);
  Memo->OnKeyDown = TKeyEvent::Bind<&TStringsEditDlg::Memo1KeyDown>(this);

  ActionList1 = CreateComponentOf<TActionList>(this);
  ActionList1->SetName("ActionList1");
  FileOpenCmd = CreateComponentOf<TAction>(this);
  FileOpenCmd->SetName("FileOpenCmd");
  FileOpenCmd->SetCaption("&Load...");
  FileOpenCmd->OnExecute = TNotifyEvent::Bind<&TStringsEditDlg::FileOpen>(this);
  FileOpenCmd->SetActionList(ActionList1);
  FileSaveCmd = CreateComponentOf<TAction>(this);
  FileSaveCmd->SetName("FileSaveCmd");
  FileSaveCmd->SetCaption("&Save...");
  FileSaveCmd->OnExecute = TNotifyEvent::Bind<&TStringsEditDlg::FileSave>(this);
  FileSaveCmd->SetActionList(ActionList1);
  UpdateStatus(this);
}

void TStringsEditDlg::SetLines(TStrings* Value) {
  inherited::SetLines(Value);
  UpdateStatus(this);
}

void TStringsEditDlg::UpdateStatus(TObject* Sender) {
  if (Sender == Memo) FModified = true;
  for (int I = 0; I < 3; ++I) StatusBar->Panels()->Items(I)->SetText(PanelText(I));
}

void TStringsEditDlg::Memo1KeyDown(TObject*, std::uint16_t& Key, TShiftState) { CancelOnEscape(Key); }

String TStringsEditDlg::PanelText(int Index) const {
  switch (Index) {
  case 0: return " " + SingleLine + ": " + IntToStr(Memo->CaretLine() + 1);
  case 1: return Column + ": " + IntToStr(Memo->CaretColumn() + 1);
  default: return Format("%s: %d", MultipleLines, Memo->Lines()->Count());
  }
}

} // namespace formkit
