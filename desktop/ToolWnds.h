//===- desktop/ToolWnds.h - Design windows with a tool bar ---------------===//
//
// `TToolbarDesignWindow` is a design window with a tool bar along its top in
// two sizes: small buttons with hints, or large ones with text labels. A
// splitter under the bar snaps it to one of the two heights and switches the
// labels with it; commands (in the window's and the bar's popup menus) show
// or hide the bar and switch the labels, and one opens the window's help.
//
// Example:
//   auto* Editor = CreateComponentOf<TItemsEditorWindow>(Application());
//   Editor->SetLargeButtons(true);   // text labels, a taller bar
//   Editor->Splitter1()->MoveTo(20); // dragged up: small buttons again
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/DesignWindows.h"
#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnSplitters.h"

namespace formkit {

/// The sizes of a design window's tool bar at the default resolution, from localisable
/// texts ("32", "24", ...); a text that is no number gives the built-in value.
struct TDesignToolbarMetrics {
  int SmallToolbarHeight;
  int SmallButtonHeight;
  int SmallButtonWidth;
  int LargeToolbarHeight;
  int LargeButtonHeight;
  int LargeButtonWidth;
};
FK_API TDesignToolbarMetrics DesignToolbarMetrics();

/// A design window with a tool bar of two sizes.
class FK_API TToolbarDesignWindow : public TDesignWindow {
  FK_CLASS(TToolbarDesignWindow, TDesignWindow)

  /// Makes the bar, the splitter, the commands and the menus, then measures the two
  /// heights of the bar and shows it small.
  void Create(TComponent* AOwner) override;

  TToolBar* ToolBar1() const noexcept { return FToolBar1; }
  TSplitter* Splitter1() const noexcept { return FSplitter1; }
  TPopupMenu* PopupMenu1() const noexcept { return FPopupMenu1; }
  TPopupMenu* PopupMenu2() const noexcept { return FPopupMenu2; }
  TActionList* ActionList1() const noexcept { return FActionList1; }
  TAction* ToolbarCmd() const noexcept { return FToolbarCmd; }
  TAction* TextLabelsCmd() const noexcept { return FTextLabelsCmd; }
  TAction* HelpCmd() const noexcept { return FHelpCmd; }

  /// Sizes the bar and its buttons, small or large, at the window's resolution.
  virtual void ResizeButtons(bool ALarge);
  bool LargeButtons() const noexcept { return FLargeButtons; }
  void SetLargeButtons(bool AValue);
  bool ToolbarVisible() const;
  void SetToolbarVisible(bool AValue);
  /// Shows or hides the bar with the splitter directly below it.
  void UpdateToolbarVisible(bool AValue);
  /// The two heights of the bar, measured at creation, at the default resolution.
  int SmallToolbarHeight() const noexcept { return FSmallHeight; }
  int LargeToolbarHeight() const noexcept { return FLargeHeight; }

protected:
  void ToolbarCmdExecute(TObject* Sender);
  void ToolbarCmdUpdate(TObject* Sender);
  void TextLabelsCmdExecute(TObject* Sender);
  void TextLabelsCmdUpdate(TObject* Sender);
  /// Enabled when the window names its help by a context other than 0, or by a keyword.
  void HelpCmdUpdate(TObject* Sender);
  void HelpCmdExecute(TObject* Sender);
  /// The bar snaps to one of its two heights.
  void Splitter1CanResize(TObject* Sender, int& ANewSize, bool& AAccept);
  void Splitter1Moved(TObject* Sender);

private:
  TAction* MakeCommand(const String& Name, const String& Caption);
  TPopupMenu* MakePopup(const String& Name, const String& ItemName, TAction* Action);
  TToolBar* FToolBar1 = nullptr;
  TSplitter* FSplitter1 = nullptr;
  TPopupMenu* FPopupMenu1 = nullptr;
  TPopupMenu* FPopupMenu2 = nullptr;
  TActionList* FActionList1 = nullptr;
  TAction* FToolbarCmd = nullptr;
  TAction* FTextLabelsCmd = nullptr;
  TAction* FHelpCmd = nullptr;
  bool FLargeButtons = false;
  int FSmallHeight = 0;
  int FLargeHeight = 0;
};

} // namespace formkit
