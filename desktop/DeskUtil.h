//===- desktop/DeskUtil.h - Window registry, desktop service, dialogs ----===//
//
// What ties the environment's windows to a desktop file: the registry of
// window classes that a desktop may name (each with its section and the host
// variable that holds its one instance), the load and save procedures that
// other units add, the host's settings that the windows need, the desktop
// service that batches window updates while a desktop loads and converts
// between pixels and the file's relative units, and the dialog service that
// shows a message safely in the middle of such a load.
//
// Example:
//   RegisterDesktopFormClass(TMessagesWindow::StaticClass(), "MessageView", "MessageView");
//   TIDEDesktopService::BeginUpdate();
//   LoadDesktopFormClasses(Desktop);   // windows created, placed while hidden
//   DoDesktopLoadProcs(Desktop);
//   TIDEDesktopService::EndUpdate();   // each placement applied once
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/Events.h"
#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnToolBars.h"
#include "platform/IniFiles.h"

#include <functional>
#include <memory>

namespace formkit {

class TDesktopForm;

/// The class record of a `TDesktopForm` descendant.
using TDesktopFormClass = TClass;
/// A procedure that reads its part of a desktop.
using TLoadDesktopProc = void (*)(TCustomIniFile* Desktop);
/// A procedure that writes its part of a desktop; `AIsProject` marks a project's desktop.
using TSaveDesktopProc = void (*)(TCustomIniFile* Desktop, bool AIsProject);

//===----------------------------------------------------------------------===//
// Starting and stopping
//===----------------------------------------------------------------------===//

/// The pieces of `Text` between commas, empty ones included ("a,,b" gives three).
[[nodiscard]] FK_API std::vector<String> SplitAtCommas(const String& Text);

/// Installs the focus hook that `GetTopWindow` reads and registers the tab and join
/// hosts (`RegisterDockHostForms`). Calls nest.
FK_API void InitializeDesktop();
/// On the last matching call: removes the hook, unregisters the hosts and frees the
/// tables of design forms and default forms with their events.
FK_API void FinalizeDesktop();

//===----------------------------------------------------------------------===//
// What the host supplies
//===----------------------------------------------------------------------===//

/// The host's settings file; unset until the host sets it.
FK_API extern std::function<TCustomIniFile*()> IDEIniFile;
/// The address of the host's variable that holds the window of an instance name, or null.
FK_API extern std::function<TCustomForm**(const String& AInstanceName)> GetFieldAddress;
/// The host's own publication and withdrawal of those addresses.
FK_API extern std::function<void(const String& AInstanceName, TCustomForm** Address)> RegisterFieldAddress;
FK_API extern std::function<void(const String& AInstanceName)> UnregisterFieldAddress;
/// Subscriptions to the creation and the showing of the main window.
FK_API extern std::function<void(const TNotifyEvent& Handler)> AddMainFormCreatedEvent;
FK_API extern std::function<void(const TNotifyEvent& Handler)> RemoveMainFormCreatedEvent;
FK_API extern std::function<void(const TNotifyEvent& Handler)> AddMainFormShownEvent;
FK_API extern std::function<void(const TNotifyEvent& Handler)> RemoveMainFormShownEvent;
/// Whether the host lets a window dock.
FK_API extern std::function<bool(TCustomForm* Form)> GetDockable;
/// Called with each `TDesktopForm` as it is created.
FK_API extern std::function<void(TDesktopForm* Form)> InitializeForm;
/// Created and fired by the host after a desktop load; not owned here.
FK_API extern TEvent* evDesktopLoaded;
/// During a load: each section name with the window created or found for it. Created by
/// the host; not owned here. A window that goes removes its own entries.
FK_API extern TStringList* LoadedDesktopFormInstances;
/// The windows `GetWorkspaceOrigin` measures from; not owned.
FK_API extern TWinControl* WorkspaceReferenceLeft;
FK_API extern TWinControl* WorkspaceReferenceTop;
/// An identifier kept for the host.
FK_API extern String DesktopId;
/// The program's command-line arguments after its name, as the host received them.
FK_API extern std::vector<String> DesktopCommandLine;

/// True when `DesktopCommandLine` holds `Switch` after a "-" or "/", without regard to case.
FK_API bool FindCmdLineSwitch(const String& Switch);

//===----------------------------------------------------------------------===//
// Toolbar metrics
//===----------------------------------------------------------------------===//

/// The heights and button sizes of tool bars, from localisable texts ("30", "22", ...);
/// a text that is no number gives the built-in value.
struct TToolbarMetrics {
  int SmallToolbarSize;
  int ButtonHeight;
  int ButtonWidth;
  int LargeToolbarSize;
  int LargeToolbarAsListSize;
  int CaptionButtonHeight;
  int CaptionButtonWidth;
};
FK_API TToolbarMetrics ToolbarMetrics();

//===----------------------------------------------------------------------===//
// Window registry
//===----------------------------------------------------------------------===//

/// Appends a registration: windows of `AFormClass` live in the host's variable of
/// `AInstanceName` and keep their state in `ADeskSection`.
FK_API void RegisterDesktopFormClass(TDesktopFormClass AFormClass, const String& ADeskSection,
                                     const String& AInstanceName);
/// Drops every registration of `AFormClass`.
FK_API void UnregisterDesktopFormClass(TDesktopFormClass AFormClass);
/// The instance name of the first registration with exactly `AFormClass` and, when
/// `ADeskSection` is not empty, that section; empty when none.
FK_API String GetInstanceName(TDesktopFormClass AFormClass, const String& ADeskSection);
/// Creates, hides or loads each registered window from `ADesktop`, in registration order.
/// A window whose load fails is reported to the application and the rest go on.
FK_API void LoadDesktopFormClasses(TCustomIniFile* ADesktop);
/// Saves each registered window that exists and saves itself, in registration order.
FK_API void SaveDesktopFormClasses(TCustomIniFile* ADesktop, bool AIsProject);

/// Adds a pair of procedures unless the same pair is there.
FK_API void RegisterDesktopProcs(TLoadDesktopProc ALoadProc, TSaveDesktopProc ASaveProc);
FK_API void UnregisterDesktopProcs(TLoadDesktopProc ALoadProc, TSaveDesktopProc ASaveProc);
/// Call each procedure that is there, in order.
FK_API void DoDesktopLoadProcs(TCustomIniFile* ADesktop);
FK_API void DoDesktopSaveProcs(TCustomIniFile* ADesktop, bool AIsProject);

//===----------------------------------------------------------------------===//
// Design and default forms
//===----------------------------------------------------------------------===//

/// Classes whose visible windows `HideDesignForms` hides and `ShowDesignForms` brings back.
FK_API void RegisterDesignForm(TClass AClass);
FK_API void UnregisterDesignForm(TClass AClass);
FK_API void HideDesignForms();
FK_API void ShowDesignForms();
/// Fired after `HideDesignForms` and after `ShowDesignForms`; owned here, made on first use.
FK_API TEvent* HideDesignFormsEvent();
FK_API TEvent* ShowDesignFormsEvent();
/// Classes whose existing windows `ShowDefaultForms` makes visible (after a load with no
/// desktop).
FK_API void RegisterDefaultForm(TClass AClass);
FK_API void UnregisterDefaultForm(TClass AClass);
FK_API void ShowDefaultForms();

//===----------------------------------------------------------------------===//
// Windows
//===----------------------------------------------------------------------===//

/// How a dock host brings a docked window forward; set by the units of dock hosts. Given
/// the form shown and its host, answers the form to go on with, or null to go on with
/// the host's parent form.
FK_API extern std::function<TCustomForm*(TCustomForm* AForm, TWinControl* AHost)> ShowDockClientHook;
/// Makes `AForm` visible where it stands: a docked window in its host, which is shown
/// in turn. Returns the form made visible.
FK_API TCustomForm* ShowDockableForm(TCustomForm* AForm);
/// Shows, restores and focuses a window; null gives null.
FK_API TCustomForm* FocusWindow(TCustomForm* AForm);
/// The active window, else the last top-level window that had the focus, else the first
/// visible, not minimised window that is not the main one.
FK_API TCustomForm* GetTopWindow();
/// The innermost desktop window around `AForm`'s focused control; `AForm` when none.
FK_API TCustomForm* GetImmediateDesktopForm(TCustomForm* AForm);
/// Where the free workspace starts: below and right of the reference windows.
FK_API TPoint GetWorkspaceOrigin();
/// Shows or hides the captions of a tool bar's buttons, sizing the buttons and the bar
/// from the toolbar metrics at the form's resolution; hints show only without captions.
/// Nothing when the bar already has that setting.
FK_API void SetShowCaptionsToolBar(TCustomForm* AForm, TToolBar* AToolBar, bool AShow);
/// What `DisableDesktop` turned off; only `EnableDesktop` turns it back on.
struct TDisabledDesktop;
struct FK_API TDisabledDesktopDeleter {
  void operator()(TDisabledDesktop* List) const noexcept;
};
using TDisabledDesktopList = std::unique_ptr<TDisabledDesktop, TDisabledDesktopDeleter>;
/// Disables every visible top-level window and shows the hourglass on the first call;
/// returns the list to give back to `EnableDesktop`, null for nested calls.
[[nodiscard]] FK_API TDisabledDesktopList DisableDesktop();
/// One release: at the last, enables the windows of `AList` that still exist and
/// restores the cursor.
FK_API void EnableDesktop(TDisabledDesktopList AList);

//===----------------------------------------------------------------------===//
// TIDEDesktopService
//===----------------------------------------------------------------------===//

/// The batch of window updates of a desktop load, the frozen drawing, and the units of
/// the desktop file.
class FK_API TIDEDesktopService {
public:
  /// Counts one more level of batching, unless the switch "UD" was given.
  static void BeginUpdate();
  /// One level less; at 0 every batched window applies its placement, in the order it
  /// joined, and the window that was active is active again.
  static void EndUpdate();
  static bool IsLocked() noexcept;
  /// The global update count.
  static int UpdateCount() noexcept;
  /// Freezes the drawing of every visible top-level desktop window (dockable ones aside).
  static void LockDrawing();
  static void UnLockDrawing();
  static bool IsDrawingLocked() noexcept;
  /// `Round(AValue / ARange * 10000)`; 0 for an empty range.
  static int ActualToRelative(int AValue, int ARange) noexcept;
  /// `Round(AValue * ARange / 10000)` with the product in 32-bit integers.
  static int RelativeToActual(int AValue, int ARange) noexcept;
  /// A value below 1 gives `ADefault`; else the value, taken as relative to the primary
  /// work area's width (height) when `APercent`.
  static int AdjustWidth(int AValue, int ADefault, bool APercent);
  static int AdjustHeight(int AValue, int ADefault, bool APercent);

  /// For windows: join and leave the batched list, which is guarded by a lock.
  static void AddLockedForm(TDesktopForm* Form);
  static void RemoveLockedForm(TDesktopForm* Form) noexcept;
  /// The batched windows, in the order they joined.
  static std::vector<TDesktopForm*> LockedForms();
};

//===----------------------------------------------------------------------===//
// TIDEDialogsService
//===----------------------------------------------------------------------===//

/// Options of the dialog service: unfreeze drawing for the dialog, and build the
/// environment's own dialog (styled, with its title bar) instead of the plain one.
FK_API extern bool DialogsUnlockDrawing;
FK_API extern bool DialogsStyled;
FK_API extern bool DialogsTitleBar;

/// Dialogs that may open in the middle of a desktop load: drawing is unfrozen while they
/// are up and frozen again afterwards.
class FK_API TIDEDialogsService {
public:
  static TModalResult MessageDlg(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons, int HelpCtx);
  static TModalResult MessageDlg(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons, int HelpCtx,
                                 TMsgDlgBtn DefaultButton);
  /// At (`X`, `Y`) when both are 0 or more, else centred on the screen.
  static TModalResult MessageDlgPos(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons, int HelpCtx,
                                    int X, int Y, TMsgDlgBtn DefaultButton);
  /// A custom message with the OK button alone.
  static void ShowMessage(const String& Msg);
  static bool InputQuery(const String& Caption, const std::vector<String>& Prompts, std::vector<String>& Values,
                         const TInputCloseQueryFunc& CloseQuery = nullptr);
  static bool InputQuery(const String& Caption, const String& Prompt, String& Value);
  /// The value typed, or `Default` when the dialog was cancelled.
  static String InputBox(const String& Caption, const String& Prompt, const String& Default);
};

} // namespace formkit
