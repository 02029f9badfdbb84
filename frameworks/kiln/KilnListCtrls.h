//===- frameworks/kiln/KilnListCtrls.h - Choices: radio buttons and lists --===//
//
// The controls a dialog offers choices with: radio buttons that exclude their
// siblings, a combo box (a drop-down list or an editable one), a list box that
// may keep its items sorted, and a bevel that only draws a line. Each gives
// itself its own size in its constructor, as the standard controls do.
//
// Example:
//   auto* Names = CreateComponentOf<TListBox>(Form);
//   Names->SetSorted(true);
//   Names->Items()->Add("Form2");                 // kept in order
//   Names->SetItemIndex(0);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"
#include "platform/Lists.h"

namespace formkit {

FK_ENUM(TComboBoxStyle, std::uint8_t, csDropDown, csSimple, csDropDownList)
FK_ENUM(TBevelShape, std::uint8_t, bsBox, bsFrame, bsTopLine, bsBottomLine, bsLeftLine, bsRightLine, bsSpacer)

/// A radio button with a caption: 113 by 17. Checking one unchecks the radio buttons
/// beside it in the same parent.
class FK_API TRadioButton : public TWinControl {
  FK_CLASS(TRadioButton, TWinControl)
  void Create(TComponent* AOwner) override;

  bool Checked() const noexcept { return FChecked; }
  /// Checks or unchecks; checking unchecks the siblings and clicks (`OnClick`).
  void SetChecked(bool Value);

private:
  bool FChecked = false;
};

/// The items of a list, with the index of the one chosen (-1 for none).
class FK_API TCustomListControl : public TWinControl {
  FK_CLASS(TCustomListControl, TWinControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The items, the control's own.
  TStrings* Items() const noexcept { return FItems.Get(); }
  int ItemIndex() const noexcept { return FItemIndex; }
  /// Chooses item `Value`; -1 chooses none. Raises `EListError` for another index
  /// outside the items.
  virtual void SetItemIndex(int Value);
  /// Called after the choice changed.
  TNotifyEvent OnChange;

protected:
  TObjectGuard<TStringList> FItems;
  int FItemIndex = -1;
};

/// A combo box: 145 by 23. As a drop-down list its text is always the chosen item.
class FK_API TComboBox : public TCustomListControl {
  FK_CLASS(TComboBox, TCustomListControl)
  void Create(TComponent* AOwner) override;

  TComboBoxStyle Style() const noexcept { return FStyle; }
  void SetStyle(TComboBoxStyle Value) noexcept { FStyle = Value; }
  /// The text shown; as a drop-down list, the chosen item's, or empty.
  String Text() const;
  void SetItemIndex(int Value) override;

private:
  TComboBoxStyle FStyle = csDropDown;
};

/// A list box: 121 by 97.
class FK_API TListBox : public TCustomListControl {
  FK_CLASS(TListBox, TCustomListControl)
  void Create(TComponent* AOwner) override;

  /// Whether the items are kept in order without regard to case.
  bool Sorted() const noexcept { return FItems->Sorted(); }
  void SetSorted(bool Value) { FItems->SetSorted(Value); }
};

/// A line or frame drawn for grouping: 50 by 50.
class FK_API TBevel : public TGraphicControl {
  FK_CLASS(TBevel, TGraphicControl)
  void Create(TComponent* AOwner) override;

  TBevelShape Shape() const noexcept { return FShape; }
  void SetShape(TBevelShape Value) noexcept { FShape = Value; }

private:
  TBevelShape FShape = bsBox;
};

} // namespace formkit
