//===- frameworks/kiln/KilnForms.h - Forms, frames, data modules, screen -===//
//
// The three kinds of root a module can have: a form (a top-level window with a
// frame and a caption around its client area), a frame (a windowed control that
// can also stand nested in another root), and a data module (a root of
// non-visual components that remembers its design size). `Screen()` keeps the
// forms that exist, the active one, and the monitors with their work areas.
//
// Example:
//   auto* Form = CreateComponentOf<TForm>(nullptr);
//   Form->SetClientWidth(400);   // Width is 400 plus the frame
//   Form->Show();                // Screen()->ActiveForm() == Form
//   Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true}});
//   Form->Close();               // hidden (the default close action)
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"
#include "frameworks/kiln/KilnScrollBox.h"
#include "frameworks/kiln/KilnWindows.h"

namespace formkit {

class TMonitor;

FK_ENUM(TFormBorderStyle, std::uint8_t, bsNone, bsSingle, bsSizeable, bsDialog, bsToolWindow, bsSizeToolWin)
FK_ENUM(TCloseAction, std::uint8_t, caNone, caHide, caFree, caMinimize)
FK_EVENT(TCloseEvent, void(TObject* Sender, TCloseAction& Action));

/// Width of a form's frame on each side, and height of its caption bar, in pixels.
inline constexpr int FormFrameWidth = 8;
inline constexpr int FormCaptionHeight = 23;

//===----------------------------------------------------------------------===//
// Forms
//===----------------------------------------------------------------------===//

/// What makes a class a root that a designer can hold: an uncounted link to the
/// designer (the designer owns the root, not the other way round), which
/// `FindRootDesigner` finds, and the root's notifications of its components passed on
/// to it, so the designer hears of every component that comes and goes.
template <class Base> class TDesignableRoot : public Base {
public:
  /// Links the designer; null unlinks. Does not take a reference.
  void SetDesigner(IDesignerNotify* Designer) noexcept { FDesigner = Designer; }
  IPtr<IDesignerNotify> GetDesigner() override { return IPtr<IDesignerNotify>(FDesigner); }
  void Notification(TComponent* AComponent, TOperation Operation) override {
    Base::Notification(AComponent, Operation);
    if (FDesigner && AComponent != this && !this->ComponentState().Contains(csDestroying))
      FDesigner->Notification(AComponent, Operation);
  }

private:
  IDesignerNotify* FDesigner = nullptr;
};

/// A top-level window. It starts hidden; its client area lies inside a frame and below
/// a caption unless its border style is `bsNone`. It streams its client size.
class FK_API TCustomForm : public TDesignableRoot<TScrollingWinControl> {
  FK_CLASS(TCustomForm, TDesignableRoot<TScrollingWinControl>)

  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  int ClientWidth() const override;
  int ClientHeight() const override;
  TPoint ClientOffset() const override;
  bool IsSizeStored() const override { return false; }

  TFormBorderStyle BorderStyle() const noexcept { return FBorderStyle; }
  /// Changes the frame; the outer bounds stay, so the client area changes.
  void SetBorderStyle(TFormBorderStyle Value) { FBorderStyle = Value; }
  /// Whether the form is scaled to the screen's pixels per inch when it is loaded.
  bool Scaled() const noexcept { return FScaled; }
  void SetScaled(bool Value) noexcept { FScaled = Value; }
  /// The pixels per inch the form's bounds are given in.
  int PixelsPerInch() const noexcept { return OwnPPI(); }
  /// Declares the pixels per inch of the bounds, without scaling them.
  void SetPixelsPerInch(int Value) { SetOwnPPI(Value); }

  /// Makes the form visible and the active form; calls `OnShow`.
  void Show() { SetVisible(true); }
  /// Hides the form; calls `OnHide`.
  void Hide() { SetVisible(false); }
  /// Asks `OnClose` what to do (hide by default) and does it: hide, free later
  /// (`ReleaseForm`), or nothing.
  void Close();
  /// Destroys the form once the message queue is processed; safe from its own handlers.
  void ReleaseForm();
  /// The monitor that holds most of the form.
  TMonitor* Monitor() const;

  // Window state and placement (defined beside the placement, in KilnWindows) ------
  TWindowState WindowState() const noexcept { return FWindowState; }
  /// Maximising keeps the bounds as the restored rectangle and fills the work area of
  /// the form's monitor; going back to normal takes the restored rectangle again.
  void SetWindowState(TWindowState Value);
  /// Where the form goes when it is restored: its bounds while it is normal.
  TRect RestoredBounds() const noexcept;
  /// The state, the restored rectangle and the show command; see `TWindowPlacement`.
  TWindowPlacement Placement() const;
  /// Applies a placement at once. Raises `EInvalidOperation` for a length other than 44
  /// or an unknown show command, and then nothing has changed.
  void SetPlacement(const TWindowPlacement& Value);
  /// Has a tool window's frame: `bsToolWindow` or `bsSizeToolWin`.
  bool IsToolWindow() const noexcept;
  /// Makes a visible form the active one; the form that was active hears `WM_ACTIVATE`
  /// with 0, this one with 1.
  void Activate();
  TPosition Position() const noexcept { return FPosition; }
  void SetPosition(TPosition Value) noexcept { FPosition = Value; }
  TDefaultMonitor DefaultMonitor() const noexcept { return FDefaultMonitor; }
  void SetDefaultMonitor(TDefaultMonitor Value) noexcept { FDefaultMonitor = Value; }
  /// Where the form's help is: a keyword, or a context number (0 for none).
  THelpType HelpType() const noexcept { return FHelpType; }
  void SetHelpType(THelpType Value) noexcept { FHelpType = Value; }
  int HelpContext() const noexcept { return FHelpContext; }
  void SetHelpContext(int Value) noexcept { FHelpContext = Value; }
  const String& HelpKeyword() const noexcept { return FHelpKeyword; }
  void SetHelpKeyword(const String& Value) { FHelpKeyword = Value; }

  TCloseEvent OnClose;
  TNotifyEvent OnShow;
  TNotifyEvent OnHide;

  /// What the form answers when it closes from modal showing; 0 while it has not.
  int ModalResult() const noexcept { return FModalResult; }
  void SetModalResult(int Value) noexcept { FModalResult = Value; }

  /// The control that has the focus within the form, or null. Not owned: it clears
  /// itself when that control goes.
  TWinControl* ActiveControl() const noexcept { return FActiveControl; }
  void SetActiveControl(TWinControl* Value);

  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override;
  void SetChildOrder(TComponent* Child, int Order) override;
  void Loaded() override;

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override;
  void WndProc(TMessage& Message) override;
  void ChangeScale(int M, int D, int NewPPI) override;

private:
  TFormBorderStyle FBorderStyle = bsSizeable;
  TWinControl* FActiveControl = nullptr;
  int FModalResult = 0;
  bool FScaled = true;
  TWindowState FWindowState = wsNormal;
  TPosition FPosition = poDesigned;
  TDefaultMonitor FDefaultMonitor = dmActiveForm;
  THelpType FHelpType = htContext;
  int FHelpContext = 0;
  String FHelpKeyword;
  TRect FRestoredBounds;
  TPoint FMinPosition{-1, -1};
  TPoint FMaxPosition{-1, -1};
};

/// The form a program derives its windows from.
class FK_API TForm : public TCustomForm {
  FK_CLASS(TForm, TCustomForm)
};

//===----------------------------------------------------------------------===//
// Frames
//===----------------------------------------------------------------------===//

/// A windowed control that is a root of its own and can stand nested in another root.
class FK_API TCustomFrame : public TDesignableRoot<TWinControl> {
  FK_CLASS(TCustomFrame, TDesignableRoot<TWinControl>)
  void Create(TComponent* AOwner) override;
  /// As a root (or nested root), the non-visual components it owns follow its controls.
  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override;
  void SetChildOrder(TComponent* Child, int Order) override;
};

class FK_API TFrame : public TCustomFrame {
  FK_CLASS(TFrame, TCustomFrame)
};

//===----------------------------------------------------------------------===//
// Data modules
//===----------------------------------------------------------------------===//

/// A root of non-visual components. It has no bounds; it remembers the size, scroll
/// offset and pixels per inch of its design window, streamed as "Height", "Width",
/// "HorizontalOffset", "VerticalOffset" and "PixelsPerInch".
class FK_API TDataModule : public TDesignableRoot<TComponent> {
  FK_CLASS(TDataModule, TDesignableRoot<TComponent>)

  TPoint DesignSize() const noexcept { return FDesignSize; }
  void SetDesignSize(TPoint Value) noexcept { FDesignSize = Value; }
  TPoint DesignOffset() const noexcept { return FDesignOffset; }
  void SetDesignOffset(TPoint Value) noexcept { FDesignOffset = Value; }
  /// 0 until a design window sets it.
  int DesignPPI() const noexcept { return FDesignPPI; }
  void SetDesignPPI(int Value) noexcept { FDesignPPI = Value; }

  void DefineProperties(TFiler* Filer) override;
  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override;
  void SetChildOrder(TComponent* Child, int Order) override;

private:
  TPoint FDesignSize;
  TPoint FDesignOffset;
  int FDesignPPI = 0;
};

//===----------------------------------------------------------------------===//
// Screen and monitors
//===----------------------------------------------------------------------===//

/// What a test or host says about one monitor.
struct TMonitorInfo {
  TRect BoundsRect;
  TRect WorkareaRect;
  int PixelsPerInch = 96;
  bool Primary = false;
};

FK_ENUM(TMonitorDefaultTo, std::uint8_t, mdNearest, mdNull, mdPrimary)

/// One monitor; owned by the screen and replaced when the monitors are set again.
class FK_API TMonitor : public TObject {
  FK_CLASS(TMonitor, TObject)
  int MonitorNum() const noexcept { return FNum; }
  TRect BoundsRect() const noexcept { return FInfo.BoundsRect; }
  /// The part of the monitor that windows may cover (without task bars).
  TRect WorkareaRect() const noexcept { return FInfo.WorkareaRect; }
  int PixelsPerInch() const noexcept { return FInfo.PixelsPerInch; }
  bool Primary() const noexcept { return FInfo.Primary; }
  int Left() const noexcept { return FInfo.BoundsRect.Left; }
  int Top() const noexcept { return FInfo.BoundsRect.Top; }
  int Width() const noexcept { return FInfo.BoundsRect.Width(); }
  int Height() const noexcept { return FInfo.BoundsRect.Height(); }

private:
  friend class TScreen;
  int FNum = 0;
  TMonitorInfo FInfo;
};

/// The process's forms and monitors.
class FK_API TScreen : public TObject {
  FK_CLASS(TScreen, TObject)

  /// One monitor of 1920 by 1080 with a work area 40 pixels shorter, at 96 pixels per inch.
  TScreen();
  void BeforeDestruction() override;

  // Forms -------------------------------------------------------------------
  int FormCount() const noexcept { return static_cast<int>(FForms.size()); }
  /// The form at `Index` in creation order; raises `EListError` when out of range.
  TCustomForm* Forms(int Index) const;
  /// The form shown last that is still visible, or null.
  TCustomForm* ActiveForm() const noexcept { return FActiveForm; }

  // Monitors ----------------------------------------------------------------
  int MonitorCount() const noexcept { return static_cast<int>(FMonitors.size()); }
  /// Raises `EListError` when out of range.
  TMonitor* Monitors(int Index) const;
  TMonitor* PrimaryMonitor() const;
  /// Replaces the monitors; with none marked primary, the first is. Raises
  /// `EInvalidOperation` for an empty list, an empty rectangle, a work area outside
  /// its monitor or a value below 1 for pixels per inch, and keeps the old monitors.
  void SetMonitors(const std::vector<TMonitorInfo>& Monitors);
  TMonitor* MonitorFromPoint(TPoint P, TMonitorDefaultTo Default = mdNearest) const;
  /// The monitor that has the largest part of `R`.
  TMonitor* MonitorFromRect(const TRect& R, TMonitorDefaultTo Default = mdNearest) const;
  /// Of the primary monitor.
  int Width() const { return PrimaryMonitor()->Width(); }
  int Height() const { return PrimaryMonitor()->Height(); }
  TRect WorkAreaRect() const { return PrimaryMonitor()->WorkareaRect(); }
  /// The union of all monitors.
  TRect DesktopRect() const;
  /// Pixels per inch of the primary monitor.
  int PixelsPerInch() const { return PrimaryMonitor()->PixelsPerInch(); }
  TCursor Cursor() const noexcept { return FCursor; }
  void SetCursor(TCursor Value) noexcept { FCursor = Value; }

private:
  friend class TCustomForm;
  void AddForm(TCustomForm* Form);
  void RemoveForm(TCustomForm* Form) noexcept;
  void FormVisibilityChanged(TCustomForm* Form, bool Visible) noexcept;
  void ClearMonitors() noexcept;
  std::vector<TCustomForm*> FForms;
  std::vector<TCustomForm*> FShown; // visible forms, the last shown last
  TCustomForm* FActiveForm = nullptr;
  std::vector<TObjectGuard<TMonitor>> FMonitors;
  TCursor FCursor = crDefault;
};

/// The process's screen, made on first use.
FK_API TScreen* Screen();

namespace detail {
/// Frees the screen (forms still alive make a new one when they go).
FK_API void FreeScreen() noexcept;
} // namespace detail

} // namespace formkit
