//===- frameworks/kiln/KilnToolBars.h - Tool bars ------------------------===//
//
// `TToolBar` is a strip of buttons along the top of a window. All its buttons
// share one size; with `ShowCaptions` they show their captions under their
// images, and a window usually makes them larger then.
//
// Example:
//   auto* Bar = CreateComponentOf<TToolBar>(Form);
//   Bar->SetParent(Form);           // aligned to the top
//   Bar->SetShowCaptions(true);
//   Bar->SetButtonHeight(36);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

class TAction;

/// A strip of equally sized buttons.
class FK_API TToolBar : public TWinControl {
  FK_CLASS(TToolBar, TWinControl)
  /// Aligned to the top, 30 pixels high, buttons of 23 by 22.
  void Create(TComponent* AOwner) override;

  bool ShowCaptions() const noexcept { return FShowCaptions; }
  void SetShowCaptions(bool Value) noexcept { FShowCaptions = Value; }
  int ButtonWidth() const noexcept { return FButtonWidth; }
  int ButtonHeight() const noexcept { return FButtonHeight; }
  /// Raise `EInvalidOperation` for a size below 1, and then the size stays.
  void SetButtonWidth(int Value);
  void SetButtonHeight(int Value);
  /// Whether the buttons show their hints.
  bool ShowHint() const noexcept { return FShowHint; }
  void SetShowHint(bool Value) noexcept { FShowHint = Value; }

private:
  bool FShowCaptions = false;
  bool FShowHint = false;
  int FButtonWidth = 23;
  int FButtonHeight = 22;
};

FK_ENUM(TToolButtonStyle, std::uint8_t, tbsButton, tbsCheck, tbsDropDown, tbsSeparator, tbsDivider)

/// A button of a tool bar, or a gap between groups of them. Linked to an action, it
/// shows the action's caption and hint, is enabled with it and runs it when clicked.
class FK_API TToolButton : public TGraphicControl {
  FK_CLASS(TToolButton, TGraphicControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  TToolButtonStyle Style() const noexcept { return FStyle; }
  void SetStyle(TToolButtonStyle Value) noexcept { FStyle = Value; }
  /// The linked action; not owned, and dropped when it goes.
  TAction* Action() const noexcept { return FAction; }
  void SetAction(TAction* Value);
  /// The action's caption, or none.
  String Caption() const;
  String Hint() const;
  /// Whether a click runs anything: a button whose action is enabled (after the action
  /// updated itself).
  bool ButtonEnabled() const;
  /// Runs the action when enabled, then calls `OnClick`.
  void Click() override;

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  TToolButtonStyle FStyle = tbsButton;
  TAction* FAction = nullptr;
};

} // namespace formkit
