//===- frameworks/kiln/KilnStdCtrls.h - Buttons, labels, edits, check boxes ===//
//
// The standard controls. Each gives itself its own size in its constructor, so a
// control dropped with a click (no dragged rectangle) has a sensible size, and
// each publishes only the properties it has.
//
// Example:
//   auto* Button = CreateComponentOf<TButton>(Form);   // 75 by 25
//   Button->SetParent(Form);
//   Button->SetName("OkButton");                         // caption follows: "OkButton"
//   Button->OnClick = TNotifyEvent::Bind<&TMyForm::OkClick>(Form);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

FK_ENUM(TCheckBoxState, std::uint8_t, cbUnchecked, cbChecked, cbGrayed)

/// A push button: 75 by 25.
class FK_API TButton : public TWinControl {
  FK_CLASS(TButton, TWinControl)
  void Create(TComponent* AOwner) override;

  /// The button that Enter presses.
  bool Default() const noexcept { return FDefault; }
  void SetDefault(bool Value) noexcept { FDefault = Value; }
  /// The button that Escape presses.
  bool Cancel() const noexcept { return FCancel; }
  void SetCancel(bool Value) noexcept { FCancel = Value; }
  /// What a modal form answers when this button closes it; 0 for none.
  int ModalResult() const noexcept { return FModalResult; }
  void SetModalResult(int Value) noexcept { FModalResult = Value; }

private:
  bool FDefault = false;
  bool FCancel = false;
  int FModalResult = 0;
};

/// A line of text: 65 by 17. Not windowed: it cannot hold the focus or children.
class FK_API TLabel : public TGraphicControl {
  FK_CLASS(TLabel, TGraphicControl)
  void Create(TComponent* AOwner) override;
  /// Whether the background shows through.
  bool Transparent() const noexcept { return FTransparent; }
  void SetTransparent(bool Value) noexcept { FTransparent = Value; }
  /// Whether the caption breaks into lines at the label's width.
  bool WordWrap() const noexcept { return FWordWrap; }
  void SetWordWrap(bool Value) noexcept { FWordWrap = Value; }
  /// Fills the background unless transparent, then writes the caption at (0, 0).
  void Paint(TCanvas* Canvas) override;
  /// The windowed control that takes the focus for this label's accelerator; null when
  /// none. Not owned: it clears itself when that control goes.
  TWinControl* FocusControl() const noexcept { return FFocusControl; }
  void SetFocusControl(TWinControl* Value);

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  bool FTransparent = false;
  bool FWordWrap = false;
  TWinControl* FFocusControl = nullptr;
};

/// A one-line text box: 121 by 23. Its text follows its name at first.
class FK_API TEdit : public TWinControl {
  FK_CLASS(TEdit, TWinControl)
  void Create(TComponent* AOwner) override;

  bool ReadOnly() const noexcept { return FReadOnly; }
  void SetReadOnly(bool Value) noexcept { FReadOnly = Value; }
  /// The most characters a user may type; 0 for no limit. Text set by a program is not cut.
  int MaxLength() const noexcept { return FMaxLength; }
  /// Raises `EInvalidOperation` for a negative value.
  void SetMaxLength(int Value);
  /// Called after the text changed, outside design and loading.
  TNotifyEvent OnChange;

protected:
  void TextChanged() override;

private:
  bool FReadOnly = false;
  int FMaxLength = 0;
};

/// A check box with a caption: 97 by 19.
class FK_API TCheckBox : public TWinControl {
  FK_CLASS(TCheckBox, TWinControl)
  void Create(TComponent* AOwner) override;

  bool Checked() const noexcept { return FState == cbChecked; }
  /// Sets the state to checked or unchecked; a change clicks the box (`OnClick`).
  void SetChecked(bool Value) { SetState(Value ? cbChecked : cbUnchecked); }
  TCheckBoxState State() const noexcept { return FState; }
  /// Raises `EInvalidOperation` for `cbGrayed` unless `AllowGrayed`.
  void SetState(TCheckBoxState Value);
  bool AllowGrayed() const noexcept { return FAllowGrayed; }
  void SetAllowGrayed(bool Value);
  /// Cycles the state as a user's click does, then clicks.
  void Toggle();

private:
  TCheckBoxState FState = cbUnchecked;
  bool FAllowGrayed = false;
};

} // namespace formkit
