//===- desktop/DockForm.h - Tool windows that dock into one another ------===//
//
// `TDockableForm` is the base of the tool windows that float, dock into a
// panel, or are dropped onto one another. A window that another is dragged
// over decides what the drop means: over its middle (the tab zone) the two
// become tabs of a new tab host, over an edge they are joined side by side in
// a new join host, on the half of the window at that edge. The hosts come
// from the unit of dock hosts, which registers a class for each kind.
// `TIDEDragDockObject` shows the drop as a translucent preview window.
//
// Example:
//   RegisterDockHostClass(dtTab, TTabDockHostForm::StaticClass());
//   TDockDrag Drag(Messages);
//   Drag.MoveTo(Center(Watches));   // Watches->IDEDockType() == dtTab
//   Drag.Drop();                    // both are tabs of a new host
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/DeskForm.h"
#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnDragDock.h"
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit {

/// What a drop on a dockable form makes: a join host or a tab host.
FK_ENUM(TIDEDockType, std::uint8_t, dtJoin, dtTab)
/// Whether a form stands above the others.
FK_ENUM(TFormStyle, std::uint8_t, fsNormal, fsStayOnTop)

/// Messages of dockable forms.
enum : std::uint32_t {
  /// The monitor's resolution may differ now; sent to a form after it moved.
  CMManualDPIChanged = 2816,
  /// Posted to a form to take its title bar away later.
  CMRemoveTitleBar = 2817,
  /// Posted by a dock host to finish an undock after the drag.
  UMFinalUndock = 1286,
  /// The framework's deferred update of a dock site.
  CMDeferredDockUpdate = 45089,
};

/// Delivers the queued `UMFinalUndock` messages, then the `CMDeferredDockUpdate` ones,
/// and those they post (final undocks always first), so that a load of many docked windows settles at once. A quit message met
/// there is posted again and ends the pump.
FK_API void PumpDockingMessages();

/// The major version of the operating system; the environment's own title bar needs 10
/// or more. Set by the host.
FK_API extern int OperatingSystemMajorVersion;

//===----------------------------------------------------------------------===//
// Dock hosts
//===----------------------------------------------------------------------===//

/// What a dock host form offers the forms docked in it, beside its form class.
class FK_API TDockHostLink {
public:
  /// `dtTab` for a host whose clients are tabs, `dtJoin` for one that joins them.
  virtual TIDEDockType HostDockType() const = 0;
  /// Docks `Client` in the host, beside `DropControl` (or all clients) at `DockAlign`.
  virtual void ManualDockClient(TControl* Client, TControl* DropControl, TAlign DockAlign, bool Focus) = 0;
  /// A client changed whether it stays on top; the host follows.
  virtual void ResetStayOnTop() = 0;

protected:
  TDockHostLink() = default;
  TDockHostLink(const TDockHostLink&) = delete;
  TDockHostLink& operator=(const TDockHostLink&) = delete;
  ~TDockHostLink() = default;
};

/// Names the form class (a `TDesktopForm` that is a `TDockHostLink`) that a drop of
/// `AType` makes; null forgets it. Set by the unit of dock hosts.
FK_API void RegisterDockHostClass(TIDEDockType AType, TClass AClass);
FK_API TClass DockHostClass(TIDEDockType AType) noexcept;
/// The host link of a control, or null.
FK_API TDockHostLink* DockHostLinkOf(TControl* Control) noexcept;

//===----------------------------------------------------------------------===//
// TDockableForm
//===----------------------------------------------------------------------===//

/// A tool window that floats, docks, or becomes a tab or a neighbour of another.
class FK_API TDockableForm : public TDesktopForm, public TDockHandler {
  FK_CLASS(TDockableForm, TDesktopForm)
public:
  /// Makes the actions, a dock site; reads "Dockable" of the host's settings when the
  /// section is set.
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  // Actions, owned by the form -------------------------------------------------------
  TActionList* DockActionList() const noexcept { return FDockActionList; }
  TAction* DockableCmd() const noexcept { return FDockableCmd; }
  TAction* StayOnTopCmd() const noexcept { return FStayOnTopCmd; }
  TAction* ZoomWindowCmd() const noexcept { return FZoomWindowCmd; }
  TAction* CloseUndockedWindowCmd() const noexcept { return FCloseUndockedWindowCmd; }
  TAction* LocalMenuCmd() const noexcept { return FLocalMenuCmd; }

  // State ------------------------------------------------------------------------
  TWinControl* ParentDrag() const noexcept { return FParentDrag; }
  TIDEDockType IDEDockType() const noexcept { return FIDEDockType; }
  TAlign DockEdge() const noexcept { return FDockEdge; }
  bool AboutToDestroy() const noexcept { return FAboutToDestroy; }
  bool VisibleOnUndock() const noexcept { return FVisibleOnUndock; }
  bool SupportsIDETitlebar() const noexcept { return FSupportsIDETitlebar; }
  bool Dockable() const noexcept { return FDockable; }
  TFormStyle FormStyle() const noexcept { return FFormStyle; }
  /// Whether the environment's own title bar is on the form.
  bool HasIDETitleBar() const noexcept { return FHasTitleBar; }
  /// The form's own popup menu; not owned through this link, and dropped when it goes.
  TPopupMenu* PopupMenu() const noexcept { return FPopupMenu; }
  void SetPopupMenu(TPopupMenu* Value);

  // Operations -------------------------------------------------------------------
  /// The tab zone in screen coordinates: the client area less a seventh of its width
  /// and a fifth of its height on each side.
  TRect GetTabDockRect() const;
  /// On a change: True makes the form a dock site dragged to dock; False floats a
  /// docked form first and makes it a plain window.
  virtual void SetDockable(bool AValue);
  /// Inverts `Dockable`; the new value.
  bool ToggleDockable();
  void SetStayOnTop(bool AValue);
  /// Makes the host for a drop and docks this form and the dropped one in it; false
  /// when no host class is registered for the drop.
  virtual bool CreateDockParent(TDragDockObject* Source, std::intptr_t& Result);
  /// Shows this form and every parent above it.
  virtual void ForceShow();
  /// Subscriber of `evDesktopLoaded`: a visible floating form gets its title bar.
  void DesktopLoaded(TObject* ASender);
  /// A parentless form loses any title bar and gets a new one.
  void TryIDETitleBar();
  /// Takes the title bar away, later (posting `CMRemoveTitleBar`) with `APost`.
  void TryRemoveTitleBar(bool APost);

  // Action handlers --------------------------------------------------------------
  void DockableCmdExecute(TObject* Sender);
  void StayOnTopCmdExecute(TObject* Sender);
  void StayOnTopCmdUpdate(TObject* Sender);
  void ZoomWindowCmdExecute(TObject* Sender);
  void CloseUndockedWindowCmdExecute(TObject* Sender);
  /// Pops up the form's menu at a third of the client width and height.
  void LocalMenuCmdExecute(TObject* Sender);

  // Docking ------------------------------------------------------------------------
  /// A client of another host may not dock on a form of that host; only dockable forms
  /// that are no join hosts dock here; a docked form takes them in its tab zone only.
  void GetSiteInfo(TControl* Client, TRect& InfluenceRect, TPoint MousePos, bool& CanDock) override;
  /// Chooses tab or join by the tab zone and shows the tab zone or the half window at
  /// the nearest edge.
  void DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) override;
  /// `CreateDockParent`, then the framework's step.
  void CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result) override;
  void DoStartDock(TDragDockObject*& DragObject) override;
  void DoEndDock(TObject* Target, int X, int Y) override;

protected:
  void WndProc(TMessage& Message) override;
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  TAction* AddAction(const char* Name, const char* Caption, bool Visible);
  TActionList* FDockActionList = nullptr;
  TAction* FDockableCmd = nullptr;
  TAction* FStayOnTopCmd = nullptr;
  TAction* FZoomWindowCmd = nullptr;
  TAction* FCloseUndockedWindowCmd = nullptr;
  TAction* FLocalMenuCmd = nullptr;
  TWinControl* FParentDrag = nullptr;
  TIDEDockType FIDEDockType = dtJoin;
  TAlign FDockEdge = alNone;
  bool FAboutToDestroy = false;
  bool FVisibleOnUndock = false;
  bool FSupportsIDETitlebar = false;
  bool FDockable = false;
  TFormStyle FFormStyle = fsNormal;
  bool FHasTitleBar = false;
  bool FSubscribed = false;
  TPopupMenu* FPopupMenu = nullptr;
};

//===----------------------------------------------------------------------===//
// The drag preview
//===----------------------------------------------------------------------===//

/// A borderless translucent window that the mouse falls through.
class FK_API TBlendForm : public TForm {
  FK_CLASS(TBlendForm, TForm)
public:
  /// The hit test's answer anywhere: transparent.
  static constexpr int HTTRANSPARENT = -1;
  int HitTest(TPoint) const noexcept { return HTTRANSPARENT; }
  int AlphaBlendValue() const noexcept { return FAlphaBlendValue; }
  void SetAlphaBlendValue(int Value) noexcept { FAlphaBlendValue = Value; }

private:
  int FAlphaBlendValue = 255;
};

/// The window colour of the theme; a bright one gives a preview of alpha 220, a dark
/// one 200. Set by the look and feel.
FK_API extern TColor ThemeWindowColor;

/// A drag object that shows the drop as a `TBlendForm` with the dragged window's caption.
class FK_API TIDEDragDockObject : public TDragDockObject {
  FK_CLASS(TIDEDragDockObject, TDragDockObject)
public:
  explicit TIDEDragDockObject(TControl* AControl);
  /// The preview; owned.
  TBlendForm* BlendForm() const noexcept { return FBlendForm.Get(); }
  /// The label with the caption; owned by the preview.
  TLabel* CaptionLabel() const noexcept { return FLabel; }
  bool GetEraseWhenMoving() const override { return false; }
  /// Places and shows the preview on the dock rectangle, scaled to its resolution.
  void DrawDragDockImage() override;
  void EraseDragDockImage() override;

private:
  TObjectGuard<TBlendForm> FBlendForm;
  TLabel* FLabel = nullptr;
};

} // namespace formkit
