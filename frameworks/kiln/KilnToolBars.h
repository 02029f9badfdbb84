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

} // namespace formkit
