//===- frameworks/kiln/design/StringsEdit.h - The string list dialog ------===//
//
// `TStringsEditDlg`, the dialog the string list and long string editors open:
// the lines in a memo of plain text, and a status bar with the caret's line
// and column and the number of lines. A change the user makes in the memo
// marks the dialog as modified; Esc in the memo cancels it.
//
// Example:
//   TObjectGuard<TStringsEditDlg> Dialog(CreateComponentOf<TStringsEditDlg>(Application()));
//   Dialog->SetLines(List);
//   if (ShowModal(Dialog.Get()) == mrOk) List->Assign(Dialog->GetLines());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/KilnMemo.h"
#include "frameworks/kiln/design/StrEdit.h"

namespace formkit {

FK_RESOURCESTRING(srLine, "line");
FK_RESOURCESTRING(srLines, "lines");
FK_RESOURCESTRING(srColumn, "column");

/// The string list dialog over a memo.
class FK_API TStringsEditDlg : public TStrEditDlg {
  FK_CLASS(TStringsEditDlg, TStrEditDlg)
  void Create(TComponent* AOwner) override;

  TStrings* GetLines() override { return Memo->Lines(); }
  void SetLines(TStrings* Value) override;
  TWinControl* GetLinesControl() override { return Memo; }

  /// The handler of the memo's changes and caret moves: any event from the memo marks
  /// the dialog as modified; the status follows the caret.
  void UpdateStatus(TObject* Sender);
  /// Esc cancels.
  void Memo1KeyDown(TObject* Sender, std::uint16_t& Key, TShiftState Shift);
  /// The text of status panel `Index`: the caret's line, its column, the number of lines.
  String PanelText(int Index) const;

  TMemo* Memo = nullptr;
  TStatusBar* StatusBar = nullptr;
  TActionList* ActionList1 = nullptr;
  TAction* FileOpenCmd = nullptr;
  TAction* FileSaveCmd = nullptr;
  String SingleLine, MultipleLines, Column;
};

} // namespace formkit
