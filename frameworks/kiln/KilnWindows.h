//===- frameworks/kiln/KilnWindows.h - Placement, focus, redraw, app -----===//
//
// What a window manager adds to windows: a top-level window's state (normal,
// minimised, maximised) and the placement record that carries its restored
// rectangle and show command; the keyboard focus and the active form; the
// redraw switch of a windowed control with its invalidations; and the
// application object that owns the program's windows, names the main one, and
// shows exceptions and help. Dock sites are in `KilnDocking`.
//
// A placement's restored rectangle is in workspace coordinates for an ordinary
// window (relative to the work area of its monitor when that work area starts
// right or below the monitor's corner) and in screen coordinates for a tool
// window, as the platform has it.
//
// Example:
//   TWindowPlacement P = Form->Placement();
//   P.rcNormalPosition = Rect(100, 100, 500, 400);
//   P.showCmd = SW_SHOWMAXIMIZED;
//   Form->SetPlacement(P);      // maximised; restores to (100, 100, 500, 400)
//   SetRedraw(Panel, false);    // Panel paints nothing until switched on
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

class TCustomForm;

FK_ENUM(TWindowState, std::uint8_t, wsNormal, wsMinimized, wsMaximized)
/// Where a form places itself when it first shows: as designed, or by the system's rule.
FK_ENUM(TPosition, std::uint8_t, poDesigned, poDefault, poDefaultPosOnly, poDefaultSizeOnly, poScreenCenter,
        poDesktopCenter, poMainFormCenter, poOwnerFormCenter)
/// The monitor a form shows on when it first shows: any (the whole desktop), the primary,
/// the main form's, or the active form's.
FK_ENUM(TDefaultMonitor, std::uint8_t, dmDesktop, dmPrimary, dmMainForm, dmActiveForm)
/// How a form's help is found: by keyword or by context number.
FK_ENUM(THelpType, std::uint8_t, htKeyword, htContext)

/// Show commands of a placement.
enum : std::uint32_t {
  SW_HIDE = 0,
  SW_SHOWNORMAL = 1,
  SW_SHOWMINIMIZED = 2,
  SW_SHOWMAXIMIZED = 3,
  SW_MAXIMIZE = 3,
  SW_SHOWNOACTIVATE = 4,
  SW_MINIMIZE = 6,
  SW_SHOWMINNOACTIVE = 7,
  SW_RESTORE = 9,
};

/// Window messages of the window manager.
enum : std::uint32_t {
  /// To a form: WParam 1 when it became the active one, 0 when it stopped being it.
  WM_ACTIVATE = 0x0006,
  /// WParam 0 switches a control's redrawing off, 1 on.
  WM_SETREDRAW = 0x000B,
  /// The resolution changed: WParam the new pixels per inch, LParam a `TRect*` of the
  /// suggested bounds.
  WM_DPICHANGED = 0x02E0,
};

/// The size a placement record declares of itself.
inline constexpr std::uint32_t WindowPlacementLength = 44;

/// Where a top-level window is, and where it goes back to.
struct TWindowPlacement {
  std::uint32_t length = WindowPlacementLength;
  std::uint32_t flags = 0;
  std::uint32_t showCmd = SW_HIDE;
  TPoint ptMinPosition{-1, -1};
  TPoint ptMaxPosition{-1, -1};
  TRect rcNormalPosition;
  friend bool operator==(const TWindowPlacement&, const TWindowPlacement&) = default;
};

//===----------------------------------------------------------------------===//
// Workspace coordinates
//===----------------------------------------------------------------------===//

/// A screen rectangle in workspace coordinates: offset by the distance from the corner
/// of the monitor nearest its top-left corner to that monitor's work area, when either
/// distance is positive.
FK_API TRect ScreenToWorkspace(const TRect& R);
/// The reverse of `ScreenToWorkspace`.
FK_API TRect WorkspaceToScreen(const TRect& R);

//===----------------------------------------------------------------------===//
// Showing and redrawing
//===----------------------------------------------------------------------===//

/// Switches the redrawing of a windowed control off or on; what `WM_SETREDRAW` does.
FK_API void SetRedraw(TWinControl* Control, bool Enabled);
/// False while a control's redrawing is switched off; true for one never switched.
FK_API bool RedrawEnabled(const TWinControl* Control) noexcept;
/// Hides a window on the screen (`SW_HIDE`) or shows it again, without changing its
/// `Visible`; a form shown is put in the state the command names. Raises
/// `EInvalidOperation` "Unknown show command %d", and then nothing has changed.
FK_API void ShowWindow(TWinControl* Control, std::uint32_t Cmd);
/// Visible, and not hidden by `ShowWindow`.
FK_API bool IsWindowVisible(const TWinControl* Control) noexcept;
/// Invalidates a control with its frame and all its children: each of them counts one
/// more invalidation.
FK_API void RedrawWindow(TWinControl* Control);
/// How often a control was invalidated since it was made.
FK_API int InvalidationCount(const TWinControl* Control) noexcept;

//===----------------------------------------------------------------------===//
// Focus
//===----------------------------------------------------------------------===//

/// Gives the keyboard focus to `Control` (null takes it away) and makes the form that
/// holds it the active one. The focus leaves a control that goes away.
FK_API void SetFocus(TWinControl* Control);
/// The control that has the focus, or null.
FK_API TWinControl* GetFocus() noexcept;
/// Told of each top-level form that receives the focus; what a focus hook sees.
FK_API extern std::function<void(TCustomForm* Form)> FocusHook;

//===----------------------------------------------------------------------===//
// TApplication
//===----------------------------------------------------------------------===//

/// The program: owner of the windows it makes, and the main one among them.
class FK_API TApplication : public TComponent {
  FK_CLASS(TApplication, TComponent)

  /// The program's main window, or null; not owned through this link.
  TCustomForm* MainForm() const noexcept { return FMainForm; }
  void SetMainForm(TCustomForm* Value);
  /// Shows an exception to the user: here it is recorded, oldest first.
  void ShowException(const std::exception& E);
  const std::vector<String>& ShownExceptions() const noexcept { return FShownExceptions; }
  void ClearShownExceptions() noexcept { FShownExceptions.clear(); }
  /// Opens the help at a context number or a keyword; here the request is recorded, as
  /// "context 12" or "keyword Name", oldest first.
  void HelpContext(int Context);
  void HelpKeyword(const String& Keyword);
  const std::vector<String>& HelpRequests() const noexcept { return FHelpRequests; }
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  TCustomForm* FMainForm = nullptr;
  std::vector<String> FShownExceptions;
  std::vector<String> FHelpRequests;
};

/// The program's application object, made on first use.
FK_API TApplication* Application();

namespace detail {
/// Frees the application object and the windows it owns.
FK_API void FreeApplication() noexcept;
} // namespace detail

} // namespace formkit
