//===- desktop/DeskForm.h - Windows that keep their state in a desktop ---===//
//
// `TDesktopForm` is the base of every environment window saved in a desktop
// file. It writes its own section (visibility, docking, state, and the restored
// rectangle in units of 1/10,000 of the primary work area) and reads it back
// onto the monitors of the moment, clipped to the virtual desktop. While a
// desktop loads, its placement is held back and its drawing frozen, and both
// are applied once when the batch ends. It also keeps the dock clients of a
// site, by section name, and the arrangement of the site as hexadecimal text.
//
// Example:
//   auto* Window = CreateComponentOf<TMessagesWindow>(Application());
//   Window->SetDeskSection("MessageView");
//   Window->SaveWindowState(Desktop, false);   // [MessageView] PercentageSizes=1 ...
//   Window->LoadWindowState(Desktop);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "desktop/DeskUtil.h"
#include "frameworks/kiln/KilnDocking.h"

namespace formkit {

/// The message a window posts itself to switch redrawing back on.
inline constexpr std::uint32_t IDEMUnlockDrawing = 1307;
/// `GetEditState` of a window that hands edits to no one: undo, redo, cut, copy, paste
/// and delete.
inline constexpr int AllEditStates = 63;

/// The position of a window held at run time, in place of reading a file.
struct TDeskRuntimeInfo {
  bool Valid = false;
  std::int32_t Left = 0;
  std::int32_t Top = 0;
  std::int32_t Width = 0;
  std::int32_t Height = 0;
  TWindowState WindowState = wsMaximized;
};

/// A window that wants to know the section it was created for.
struct FK_API IDesktopFormCreator : IInterface {
  FK_INTERFACE(IDesktopFormCreator, IInterface, "{12AB3308-1456-4E78-B3BF-8CF8A0846A88}")
  virtual void SetDeskSection(const String& ASection) = 0;
};

FK_RESOURCESTRING(SLoadingDesktopFailed,
                  "Loading the desktop from \"%s\" for dock host window \"%s\" failed with message: "
                  "\r\n\r\n\"%s: %s\"");

/// A window saved in a desktop.
class FK_API TDesktopForm : public TForm, public IEditHandler {
  FK_CLASS(TDesktopForm, TForm)
  FK_INTERFACES(IEditHandler)

  /// Joins the batch at once when a desktop is loading.
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  // Desktop ---------------------------------------------------------------------
  const String& DeskSection() const noexcept { return FDeskSection; }
  void SetDeskSection(const String& Value) { FDeskSection = Value; }
  /// False keeps the window out of a saved desktop.
  bool AutoSave() const noexcept { return FAutoSave; }
  void SetAutoSave(bool Value) noexcept { FAutoSave = Value; }
  /// In the batch of a desktop load.
  bool Locked() const noexcept { return FLocked; }
  bool LoadedFromDesktop() const noexcept { return FLoadedFromDesktop; }
  bool WindowPlacementDirty() const noexcept { return FWindowPlacementDirty; }
  const TWindowPlacement& WindowPlacement() const noexcept { return FWindowPlacement; }
  /// Where the last load put the window, in screen coordinates.
  TRect LastLoadedBounds() const noexcept { return FLastLoadedBounds; }
  bool DockingTouched() const noexcept { return FDockingTouched; }
  void SetDockingTouched(bool Value) noexcept { FDockingTouched = Value; }
  /// Saves and honours the resolution and monitor number of the window.
  bool AllowAdjustPosForDPI() const noexcept { return FAllowAdjustPosForDPI; }
  void SetAllowAdjustPosForDPI(bool Value) noexcept { FAllowAdjustPosForDPI = Value; }
  int DrawingLockCount() const noexcept { return FDrawingLockCount; }
  /// Kept for windows that scale their font; the desktop does not read them.
  int FontPointSize() const noexcept { return FFontPointSize; }
  void SetFontPointSize(int Value) noexcept { FFontPointSize = Value; }
  bool SaveStateNecessary() const noexcept { return FSaveStateNecessary; }
  void SetSaveStateNecessary(bool Value) noexcept { FSaveStateNecessary = Value; }
  bool UnlockMessagePosted() const noexcept { return FUnlockMessagePosted; }
  /// Whether a maximised window still takes its bounds from the file; for all windows.
  static bool ForceUpdateBounds() noexcept;
  static void SetForceUpdateBounds(bool Value) noexcept;
  /// Has a dock host.
  bool Docked() const noexcept { return HostDockSite(this) != nullptr; }
  /// The application's main window.
  bool IsMainForm() const noexcept;

  // Operations of the desktop, in this order ------------------------------------------
  /// Maximises a normal window and restores a maximised one.
  virtual void ZoomWindow();
  /// A cleared record: a window held at run time answers its own.
  virtual TDeskRuntimeInfo GetDeskRuntimeInfo();
  /// Adjusts `FLastLoadedBounds` after it was read; nothing by default.
  virtual void AdjustLastLoadedBounds() {}
  /// Passes the edit to the innermost desktop window or frame of the focus.
  bool EditAction(TEditAction AAction) override;
  TEditState GetEditState() override;
  /// The window's position and state, relative, as a valid record.
  virtual void SaveWindowRuntimeInfo(TDeskRuntimeInfo& AInfo);
  /// Writes the window's section; a null desktop does nothing.
  virtual void SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject);
  /// Reads the window's section; a null desktop does nothing.
  virtual void LoadWindowState(TCustomIniFile* ADesktop);
  /// Writes the sections of `ASite`'s dock clients, comma-separated, under `AKey`.
  virtual void SaveDockClients(TCustomIniFile* ADesktop, bool AIsProject, const String& AKey, TWinControl* ASite);
  /// Writes the arrangement of `ASite` as hexadecimal text under `AKey`.
  virtual void SaveDockStream(TCustomIniFile* ADesktop, const String& AKey, TWinControl* ASite);
  /// Docks the windows named under `AKey` into `ASite` and undocks the others; true when
  /// the key names any.
  virtual bool LoadDockClients(TCustomIniFile* ADesktop, const String& AKey, TWinControl* ASite);
  /// Loads the clients docked by `LoadDockClients`, then the arrangement of `ASite`.
  virtual void LoadDockStream(TCustomIniFile* ADesktop, const String& AKey, TWinControl* ASite);

  /// Told when the main window shows; nothing by default.
  virtual void DoMainFormShown() {}
  /// Leaves the batch: applies the held placement, then resumes drawing.
  virtual void UnlockUpdates();
  /// Joins the batch and freezes drawing.
  virtual void LockUpdates();
  virtual bool ShouldAutoHide() { return true; }

  // Drawing ---------------------------------------------------------------------
  /// Freezes the redrawing of the child windows on the first lock; counts the others.
  void LockDrawing();
  /// At the last unlock, posts `IDEMUnlockDrawing` to switch redrawing back on.
  void UnlockDrawing();
  /// False keeps the window out of the desktop service's drawing lock.
  virtual bool FollowsGlobalDrawingLock() const { return true; }

  // Units of the desktop file ---------------------------------------------------------
  /// Screen pixels to relative units of the primary work area; a docked window's
  /// position stays.
  void DesktopPosActualToRelative(int& X, int& Y) const;
  static void DesktopSizeActualToRelative(int& W, int& H);
  /// Relative units to screen pixels, clipped to the virtual desktop.
  static void DesktopPosRelativeToActual(int& X, int& Y);
  /// Converts only values above 0.
  static void DesktopSizeRelativeToActual(int& W, int& H);
  /// The rectangle the desktop (or `AInfo`, when valid) gives the window.
  TRect GetDeskWindowScreenCoordinates(TCustomIniFile* ADesktop, const TDeskRuntimeInfo& AInfo);
  TWindowState GetDeskWindowState(TCustomIniFile* ADesktop, const TDeskRuntimeInfo& AInfo);

protected:
  void WndProc(TMessage& Message) override;
  /// Whether `LockDrawing` applies to this window; a dock host narrows it.
  virtual bool CanLockDrawing() const { return true; }
  /// Before a host loads this window as a dock client; a dock host keeps itself alive.
  virtual void PrepareLoadAsDockClient() {}

private:
  void MainFormShown(TObject* Sender);
  TRect WorkspaceRestoredRect(const TWindowPlacement& P) const;
  /// Moves the held placement onto a monitor: to the origin when neither top corner
  /// lies on one, and clipped to the right and bottom of its monitor.
  void KeepPlacementOnAMonitor();
  void ApplyPlacement();
  void ApplyDirtyPlacement();
  /// Steps of a load once the section says the window exists.
  void LoadPlacement(TCustomIniFile* ADesktop, bool AMain);
  void FillPlacement(TWindowState State, bool Visible);
  void ScaleLoadedBoundsForDPI(TCustomIniFile* ADesktop);
  void NotifyParentResolution();
  void LoadDockClient(TDesktopForm* Client, TCustomIniFile* ADesktop);
  String SectionOrClass() const;

  bool FAutoSave = false;
  String FDeskSection;
  std::int32_t FFontPointSize = 0;
  bool FLocked = false;
  std::int32_t FDrawingLockCount = 0;
  bool FUnlockMessagePosted = false;
  bool FLoadedFromDesktop = false;
  bool FSaveStateNecessary = false;
  TWindowPlacement FWindowPlacement;
  bool FWindowPlacementDirty = false;
  TRect FLastLoadedBounds;
  bool FDockingTouched = false;
  bool FAllowAdjustPosForDPI = false;
  bool FSubscribedToMainForm = false;
};

/// The form a control stands on, at any depth; null when none.
FK_API TCustomForm* GetParentForm(const TControl* Control) noexcept;
/// Bytes as two uppercase hexadecimal digits each, and back; `HexToBin` raises
/// `EConvertError` for text of odd length or with other characters.
FK_API String BinToHex(const std::vector<std::uint8_t>& Bytes);
[[nodiscard]] FK_API std::vector<std::uint8_t> HexToBin(const String& Text);

} // namespace formkit
