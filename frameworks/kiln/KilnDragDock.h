//===- frameworks/kiln/KilnDragDock.h - Dragging controls to dock them ---===//
//
// The drag side of docking: the drag-dock object that travels with a drag and
// carries the rectangle the drop would fill, the virtual steps through which a
// control takes part as a dragged client or as a site (site info, dock-over,
// drop, undock, dock notifications), and a drag that a test or a host drives
// with screen points: begin, move, drop.
//
// A control takes part by deriving from `TDockHandler` beside its control
// class; a site without it behaves as the defaults below say.
//
// Example:
//   TDockDrag Drag(ToolWindow);        // DoStartDock, the drag object made
//   Drag.MoveTo(Point(640, 300));      // GetSiteInfo and DockOver of the site below
//   Drag.Drop();                       // CMDockClient of the site, DoEndDock
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDocking.h"

#include <functional>

namespace formkit {

class TDragDockObject;

/// Where a drag stands relative to a site: it came in, it left, or it moved inside.
FK_ENUM(TDragState, std::uint8_t, dsDragEnter, dsDragLeave, dsDragMove)
/// How a control is dragged: as a payload for a drop, or to dock.
FK_ENUM(TDragKind, std::uint8_t, dkDrag, dkDock)
/// Whether a drag starts by itself when the mouse is pressed on the control.
FK_ENUM(TDragMode, std::uint8_t, dmManual, dmAutomatic)

/// What a dock notification reports of a client: its visibility or its caption changed.
enum class TDockNotifyKind : std::uint8_t { VisibleChanged, CaptionChanged };

/// Asked whether a site accepts a drag, after the site's own answer.
using TDockOverEvent = std::function<void(TObject* Sender, TDragDockObject* Source, int X, int Y, TDragState State,
                                          bool& Accept)>;

//===----------------------------------------------------------------------===//
// TDragDockObject
//===----------------------------------------------------------------------===//

/// The state of one dock drag: the dragged control, the site below the mouse, the
/// rectangle the drop would fill (screen coordinates) and where in the site it goes.
/// The drag owns it; the control and the target are not owned.
class FK_API TDragDockObject : public TObject {
  FK_CLASS(TDragDockObject, TObject)
public:
  explicit TDragDockObject(TControl* AControl);

  TControl* Control() const noexcept { return FControl; }
  /// The rectangle a drop would fill, in screen coordinates.
  const TRect& DockRect() const noexcept { return FDockRect; }
  void SetDockRect(const TRect& Value) noexcept { FDockRect = Value; }
  /// The mouse position in screen coordinates.
  TPoint DragPos() const noexcept { return FDragPos; }
  void SetDragPos(TPoint Value) noexcept { FDragPos = Value; }
  /// The site below the mouse that may take the control; null over none.
  TWinControl* DragTarget() const noexcept { return FDragTarget; }
  void SetDragTarget(TWinControl* Value) noexcept { FDragTarget = Value; }
  /// The side of `DropOnControl` (or of the whole site) a drop takes.
  TAlign DropAlign() const noexcept { return FDropAlign; }
  void SetDropAlign(TAlign Value) noexcept { FDropAlign = Value; }
  TControl* DropOnControl() const noexcept { return FDropOnControl; }
  void SetDropOnControl(TControl* Value) noexcept { FDropOnControl = Value; }
  /// A drop that would float the control.
  bool Floating() const noexcept { return FDragTarget == nullptr; }

  /// The edge of the target's window rectangle nearest to `MousePos` (screen
  /// coordinates), by `NearestEdge`; `alNone` without a target.
  TAlign GetDockEdge(TPoint MousePos) const;

  /// Shows the drop rectangle; the base keeps it as the one shown.
  virtual void DrawDragDockImage();
  /// Hides what `DrawDragDockImage` showed.
  virtual void EraseDragDockImage();
  /// Whether the image is erased before each move.
  virtual bool GetEraseWhenMoving() const { return true; }
  /// What the base image shows, and whether it shows.
  const TRect& ImageRect() const noexcept { return FImageRect; }
  bool ImageVisible() const noexcept { return FImageVisible; }

private:
  TControl* FControl;
  TRect FDockRect;
  TPoint FDragPos;
  TWinControl* FDragTarget = nullptr;
  TAlign FDropAlign = alNone;
  TControl* FDropOnControl = nullptr;
  TRect FImageRect;
  bool FImageVisible = false;
};

//===----------------------------------------------------------------------===//
// TDockHandler
//===----------------------------------------------------------------------===//

/// The virtual steps of docking, for a control class to derive from beside its control
/// base. Each default is the framework's step, which an override may call as its
/// inherited step. The handler is the control itself; it owns nothing.
class FK_API TDockHandler {
public:
  // As a site ---------------------------------------------------------------------
  /// Whether `Client` may dock here with the mouse at `MousePos` (screen coordinates);
  /// `InfluenceRect` is the screen area in which the site counts. The default keeps
  /// `CanDock` as given.
  virtual void GetSiteInfo(TControl* Client, TRect& InfluenceRect, TPoint MousePos, bool& CanDock);
  /// The drag is over the site at (`X`, `Y`), client coordinates. The default places the
  /// dock rectangle (`PositionDockRect`) and asks `DoDockOver`.
  virtual void DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept);
  /// The drop: `Message.Result` 0 lets the default dock the control with `DockDrop`.
  virtual void CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result);
  /// Docks the dragged control at the place the drag chose.
  virtual void DockDrop(TDragDockObject* Source, int X, int Y);
  /// Asked before `Client` leaves for `NewTarget` (null: floating); false keeps it.
  virtual bool DoUnDock(TWinControl* NewTarget, TControl* Client);
  /// `Client` is about to leave the site (it is still among the clients): the default
  /// drops its zone.
  virtual void CMUnDockClient(TControl* Client, TWinControl* NewTarget);
  /// A client's state changed: the default lays the zones out again.
  virtual void CMDockNotification(TControl* Client, TDockNotifyKind Kind);
  /// The client that a saved arrangement names `Name`, or null: by default the client
  /// of that name, compared without regard to case.
  virtual TControl* ReloadDockedControl(const String& Name);

  // As a client -------------------------------------------------------------------
  /// A drag starts: the default keeps `DragObject` (null lets the drag make a plain one).
  virtual void DoStartDock(TDragDockObject*& DragObject);
  /// The drag ended on `Target` (null: floating or cancelled) at screen (`X`, `Y`).
  virtual void DoEndDock(TObject* Target, int X, int Y);

  TDragKind DragKind() const noexcept { return FDragKind; }
  void SetDragKind(TDragKind Value) noexcept { FDragKind = Value; }
  TDragMode DragMode() const noexcept { return FDragMode; }
  void SetDragMode(TDragMode Value) noexcept { FDragMode = Value; }
  /// The site's own answer to a drag over it.
  TDockOverEvent OnDockOver;

protected:
  TDockHandler() = default;
  TDockHandler(const TDockHandler&) = delete;
  TDockHandler& operator=(const TDockHandler&) = delete;
  ~TDockHandler() = default;
  /// Sets `Source`'s dock rectangle: the half of the drop zone at the edge nearest the
  /// mouse, or the whole site without zones.
  void PositionDockRect(TDragDockObject* Source);
  /// Asks `OnDockOver`, when set.
  void DoDockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept);
  /// The control this handler is.
  TControl* HandlerControl();

private:
  TDragKind FDragKind = dkDrag;
  TDragMode FDragMode = dmManual;
};

/// The handler of a control, or null when it has none.
FK_API TDockHandler* DockHandlerOf(TControl* Control) noexcept;
/// The width a control takes in a site along the left or right edge, and the height in
/// one along the top or bottom: what it had when it last left such a site, else its
/// size now.
FK_API int LRDockWidth(const TControl* Control) noexcept;
FK_API int TBDockHeight(const TControl* Control) noexcept;
FK_API void SetLRDockWidth(TControl* Control, int Value);
FK_API void SetTBDockHeight(TControl* Control, int Value);
/// The screen rectangle of a control: its bounds, moved by its parent's client origin.
FK_API TRect ScreenBoundsOf(const TControl* Control);
/// How far, in X or in Y, the mouse moves with a button down before a drag begins.
FK_API extern int DragThreshold;
/// The edge of `R` nearest to `P`, compared as fractions of the width and the height;
/// ties go to left, top, right, bottom in that order. `alNone` when `P` is outside.
FK_API TAlign NearestEdge(const TRect& R, TPoint P) noexcept;
/// The half of `R` along `Edge` (integer halves, toward zero); all of `R` for `alNone`
/// and `alClient`.
FK_API TRect EdgeHalf(const TRect& R, TAlign Edge) noexcept;

//===----------------------------------------------------------------------===//
// TDockDrag
//===----------------------------------------------------------------------===//

/// One dock drag of a control, driven by screen points. The site below a point is, in
/// the first visible top-level window under it (the last made first) that has one, the
/// innermost dock site that is not the dragged control or inside it and whose
/// `GetSiteInfo` accepts it. Ending
/// without `Drop` cancels: nothing moves, and the client hears `DoEndDock` with no target.
class FK_API TDockDrag {
public:
  /// Starts the drag: `DoStartDock` of the control; the drag owns the object it gives.
  explicit TDockDrag(TControl* AControl);
  ~TDockDrag();
  TDockDrag(const TDockDrag&) = delete;
  TDockDrag& operator=(const TDockDrag&) = delete;

  /// Moves the mouse to `P` (screen): leaves the old site and enters the new one as
  /// the case may be, asks its `DockOver`, and redraws the image.
  void MoveTo(TPoint P);
  /// Drops where the mouse is: on an accepting site through its `CMDockClient`, else
  /// floating at the dock rectangle. A site the control leaves is asked `DoUnDock`
  /// first; a refusal leaves everything as it was. True when the control moved.
  bool Drop();
  /// Ends without a drop.
  void Cancel();
  /// The drag object; owned by the drag.
  TDragDockObject* DragObject() const noexcept { return FObject; }
  /// Whether the site below the mouse accepted at the last move.
  bool Accepted() const noexcept { return FAccepted; }

private:
  void EndImage() noexcept;
  TWinControl* SiteAt(TPoint P) const;
  TControl* FControl;
  TDragDockObject* FObject = nullptr;
  TObjectGuard<TDragDockObject> FOwned;
  bool FAccepted = false;
  bool FEnded = false;
};

namespace detail {
/// The site `Control` is docked in hears it go to `NewTarget` (null: floating), and it
/// leaves the site's clients.
FK_API void SendUndockClient(TControl* Control, TWinControl* NewTarget);
/// `Control`'s site hears that its visibility changed.
FK_API void SendDockNotification(TControl* Control, TDockNotifyKind Kind);
} // namespace detail

} // namespace formkit
