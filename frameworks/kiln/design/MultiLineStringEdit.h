//===- frameworks/kiln/design/MultiLineStringEdit.h - A caption of several lines ===//
//
// `TMultiLineStringProperty` edits a string property in a dialog of its own,
// `TMultiLineStringEditDlg`: line breaks inside the text stay, those at its
// end are dropped. The dialog has no file commands and no way to the code
// editor; it keeps its own size and place between openings.
//
// Example:
//   RegisterPropertyEditor(TypeInfo_TCaption(), TLabel::StaticClass(), "Caption",
//                          TMultiLineStringProperty::StaticClass());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnMemo.h"
#include "frameworks/kiln/design/StrEdit.h"

namespace formkit {

FK_RESOURCESTRING(SMultiLineStringEditDlgCaption, "Multi-Line String Editor");

/// The placement of `TMultiLineStringEditDlg`.
FK_API TDialogPlacement& MultiLineStringEditDlgPlacement() noexcept;

/// The dialog of a multi-line string: a memo and the OK and Cancel buttons.
class FK_API TMultiLineStringEditDlg : public TForm {
  FK_CLASS(TMultiLineStringEditDlg, TForm)
  void Create(TComponent* AOwner) override;
  /// Stores the dialog's size and place for the next one.
  void BeforeDestruction() override;

  static constexpr int MinWidth = 400, MinHeight = 240;

  /// Takes the size and place of the last dialog.
  void FormShow(TObject* Sender);
  /// Esc cancels.
  void CaptionEditKeyDown(TObject* Sender, std::uint16_t& Key, TShiftState Shift);

  TButton* OkButton = nullptr;
  TButton* Cancel = nullptr;
  TPanel* pnMain = nullptr;
  TPanel* pnBottom = nullptr;
  TMemo* CaptionEdit = nullptr;

private:
  bool FUpdatingPos = false;
};

/// A string property whose value may hold line breaks.
class FK_API TMultiLineStringProperty : public TStringProperty {
  FK_CLASS(TMultiLineStringProperty, TStringProperty)
  /// Exactly a dialog, several components at once, and written as typed.
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paDialog, paMultiSelect, paAutoUpdate}; }
  void Edit() override;
};

} // namespace formkit
