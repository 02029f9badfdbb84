//===- frameworks/kiln/design/ValueEdit.h - Name and value lists in a dialog ===//
//
// `TValueListProperty` edits a list of "Name=Value" lines in `TValueEditDlg`,
// a grid of names and values, and goes on into the code editor the way every
// string list editor does. A change from the grid marks the dialog as
// modified; Esc cancels it.
//
// Example:
//   RegisterPropertyEditor(TStrings::StaticClass()->TypeInfo(), TValueListEditor::StaticClass(),
//                          "Strings", TValueListProperty::StaticClass());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnValEdit.h"
#include "frameworks/kiln/design/StrEdit.h"

namespace formkit {

FK_RESOURCESTRING(SValueEditDlgCaption, "Value List Editor");

/// The string list dialog over a grid of names and values.
class FK_API TValueEditDlg : public TStrEditDlg {
  FK_CLASS(TValueEditDlg, TStrEditDlg)
  void Create(TComponent* AOwner) override;

  TStrings* GetLines() override { return ValueListEditor1->Strings(); }
  TWinControl* GetLinesControl() override { return ValueListEditor1; }

  /// A change from the grid marks the dialog as modified.
  void ValueListEditor1StringsChange(TObject* Sender);
  /// Esc cancels.
  void ValueListEditor1KeyDown(TObject* Sender, std::uint16_t& Key, TShiftState Shift);

  TValueListEditor* ValueListEditor1 = nullptr;
};

/// A list of names and values: the value list dialog, or the code editor.
class FK_API TValueListProperty : public TStringListProperty {
  FK_CLASS(TValueListProperty, TStringListProperty)
  TStrEditDlg* EditDialog() override;
};

} // namespace formkit
