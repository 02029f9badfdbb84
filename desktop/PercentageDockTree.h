//===- desktop/PercentageDockTree.h - The dock tree of the environment ---===//
//
// `TPercentageDockTree` is the dock manager of every dock site of the
// environment: zones that keep their proportions when the site resizes (the
// framework's tree does that), a caption per client whose close and pin
// buttons light up under the mouse, and a check that refuses splitter moves
// which would squeeze the columns of an editor panel below 230 pixels.
// `DefaultInsertAt` steers the next visible docking to a side.
//
// Example:
//   SetDockManager(Panel, New<TPercentageDockTree>(Panel, dcoHorizontal));
//   DefaultInsertAt = alBottom;
//   ManualDock(Messages, Panel, Watches, alRight);   // goes below Watches instead
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDockTree.h"

#include <map>

namespace formkit {

/// The side that the next visible docking takes, whatever its caller asked; reset to
/// `alNone` by that docking.
FK_API extern TAlign DefaultInsertAt;

/// The theme's font for captions; empty and 0 without a theme. Set by the look and feel.
FK_API extern String ThemeCaptionFontName;
FK_API extern int ThemeCaptionFontSize;
/// What the theme adds to a caption's text height, in pixels.
FK_API extern int ThemeCaptionPadding;

/// The caption font of the trees of `ASite`: the theme's font, or "Segoe UI" 9 without
/// one, at least 12 points, at the site's resolution. One object shared by all trees,
/// filled again by each call; owned here.
FK_API TFont* GetCaptionDockedThemeFont(TWinControl* ASite);

/// The caption state of one client.
class FK_API TDockTreeInfo : public TObject {
  FK_CLASS(TDockTreeInfo, TObject)
public:
  /// The caption as last painted, in the site's client coordinates.
  TRect FCaptionRect;
  /// The caption button under the mouse: `HTCLOSE`, `HTPIN`, or 0 for none.
  int FHotButton = 0;
};

/// Places the caption buttons as the environment draws them and paints captions.
class FK_API TPercentageCaptionDrawer : public TDockCaptionDrawer {
  FK_CLASS(TPercentageCaptionDrawer, TDockCaptionDrawer)
public:
  using TDockCaptionDrawer::TDockCaptionDrawer;
  /// The side of the square buttons: the caption's width less 8 for vertical captions,
  /// 20 for horizontal ones, scaled to the site's resolution.
  int CalcButtonSize(const TRect& ACaption, TWinControl* ASite) const;
  TRect GetCloseRect(const TRect& ACaption, TWinControl* ASite) const override;
  TRect GetPinRect(const TRect& ACaption, TWinControl* ASite) const override;
  /// Paints a caption: filled by focus, the two buttons (framed when hot), the text.
  void DrawDockCaptionEx(TCanvas* ACanvas, TControl* AControl, const TRect& ACaption, bool AFocused,
                         const TDockTreeInfo& AInfo, TWinControl* ASite) const;
  /// `DrawDockCaptionEx` with a fresh caption state.
  void DrawDockCaption(TCanvas* ACanvas, TControl* AControl, const TRect& ACaption, bool AFocused,
                       TWinControl* ASite) const;
};

/// The dock tree of the environment's dock sites. Made for a site; does not own it.
class FK_API TPercentageDockTree : public TCaptionedTabDockTree {
  FK_CLASS(TPercentageDockTree, TCaptionedTabDockTree)
public:
  TPercentageDockTree(TWinControl* ADockSite, TDockCaptionOrientation AOrientation);

  /// The caption state of a client, or null.
  TDockTreeInfo* InfoOf(const TControl* Control) const;
  TPoint LastMouseDownPos() const noexcept { return FLastMouseDownPos; }

  /// 0 for an editor panel with clients that hides captions; else the caption font's
  /// height plus the theme's padding, 24 without a font.
  int GetGrabberSize() const override;
  TRect AdjustCaptionRect(const TRect& ARect) const override;
  bool MouseDown(TMouseButton Button, int X, int Y) override;
  void MouseMove(int X, int Y) override;
  /// Refuses a splitter move in an editor panel of several columns that would leave a
  /// column narrower than 230 (scaled), then ends the move.
  void MouseUp(TMouseButton Button, int X, int Y, bool& Handled) override;
  void MouseLeave() override;
  void InsertControl(TControl* Control, TAlign InsertAt, TControl* DropControl) override;
  void RemoveControl(TControl* Control) override;
  /// Stores the caption rectangle of `Control` and paints its caption.
  void PaintDockFrame(TCanvas* ACanvas, TControl* Control, const TRect& ARect) override;

protected:
  std::unique_ptr<TDockCaptionDrawer> GetDockCaptionDrawer() const override;

private:
  /// Whether the splitter move to `X` leaves every column wide enough; true when no
  /// check applies.
  bool SplitterMoveAllowed(int X) const;
  void Repaint() const;
  std::map<const TControl*, TObjectGuard<TDockTreeInfo>> FControls;
  TPoint FLastMouseDownPos;
};

} // namespace formkit
