//===- frameworks/kiln/KilnValEdit.h - A grid of names and values ---------===//
//
// `TValueListEditor`, a two-column grid over a string list of "Name=Value"
// lines: the first column shows the names, the second the values. Every
// change of the lines is told through `OnStringsChange` (outside design and
// loading); `KeyOptions` says whether the user may edit, add and delete names.
// The lines go to form files as "Strings.Strings".
//
// Example:
//   TValueListEditor* Grid = CreateComponentOf<TValueListEditor>(Form);
//   Grid->Strings()->SetValues("Width", "80");
//   Grid->Strings()->Values("Width");     // "80"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnMemo.h"

namespace formkit {

/// What a user may do with the names of a value list.
FK_ENUM(TKeyOption, std::uint8_t, keyEdit, keyAdd, keyDelete, keyUnique)
FK_SET(TKeyOptions, TKeyOption)

/// A grid of names and values: 306 by 300, two columns of 150 pixels.
class FK_API TValueListEditor : public TWinControl {
  FK_CLASS(TValueListEditor, TWinControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The "Name=Value" lines, the grid's own.
  TStrings* Strings() const noexcept { return FStrings.Get(); }
  /// Copies `Value`'s lines.
  void SetStrings(TStrings* Value) { FStrings->Assign(Value); }
  TKeyOptions KeyOptions() const noexcept { return FKeyOptions; }
  void SetKeyOptions(TKeyOptions Value) noexcept { FKeyOptions = Value; }
  /// The width of column `Index` (0 names, 1 values); raises `EListError` for another.
  int ColWidth(int Index) const;
  void SetColWidth(int Index, int Value);

  /// A key went down: `OnKeyDown` hears it.
  void KeyDown(std::uint16_t& Key, TShiftState Shift);

  /// Called after the lines changed, outside design and loading.
  TNotifyEvent OnStringsChange;
  TKeyEvent OnKeyDown;

private:
  void StringsChanged(TObject* Sender);
  int& Column(int Index);

  TObjectGuard<TStoredStrings> FStrings;
  TKeyOptions FKeyOptions;
  int FColWidths[2] = {150, 150};
};

} // namespace formkit
