//===- frameworks/kiln/KilnDocking.h - Dock sites and their clients ------===//
//
// A windowed control can be a dock site: controls docked in it become its
// children and its clients, in the order they docked, until they float again
// or go. A site may have a dock manager that keeps the arrangement of its
// clients and saves and restores it as bytes.
//
// Example:
//   SetDockSite(Host, true);
//   ManualDock(Messages, Host);        // HostDockSite(Messages) == Host
//   ManualFloat(Messages, Rect(100, 100, 500, 400));
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"
#include "platform/Streams.h"

namespace formkit {

/// What a dock site keeps of the arrangement of its clients, saved and restored as bytes.
struct FK_API IDockManager : IInterface {
  FK_INTERFACE(IDockManager, IInterface, "{5D0F3A61-8C2E-4B7A-9E14-3F6A2B8C7D90}")
  virtual void SaveToStream(TStream* Stream) = 0;
  virtual void LoadFromStream(TStream* Stream) = 0;
};

/// A dock manager that lays its clients out in zones: told of each client that docks or
/// leaves, and of changes of the site's size or a client's visibility. Found on a
/// site's manager with `Supports`.
struct FK_API IDockZones : IInterface {
  FK_INTERFACE(IDockZones, IInterface, "{9B2E6C14-7A3D-4F58-B1C0-2D8E5F4A6B13}")
  /// Places `Control` beside `DropControl` (or beside all clients when it is null) at the
  /// side `InsertAt` names.
  virtual void InsertControl(TControl* Control, TAlign InsertAt, TControl* DropControl) = 0;
  /// Forgets `Control`; nothing when it has no zone.
  virtual void RemoveControl(TControl* Control) = 0;
  /// `NewControl` takes the zone of `Control`, which has none afterwards.
  virtual void ReplaceControl(TControl* Control, TControl* NewControl) = 0;
  /// Lays the clients out again; without `Force` only when the site's size changed.
  virtual void ResetBounds(bool Force) = 0;
};

/// Makes a windowed control a place where others dock, or no longer one.
FK_API void SetDockSite(TWinControl* Site, bool Value);
FK_API bool IsDockSite(const TWinControl* Site) noexcept;
/// The site a control is docked in, or null when it floats.
FK_API TWinControl* HostDockSite(const TControl* Control) noexcept;
/// The controls docked in `Site`, in the order they docked.
FK_API std::vector<TControl*> DockClients(const TWinControl* Site);
/// Docks `Control` into `Site` as its last client, out of any site it was in: it becomes
/// a child of the site, and a zoned manager places it at `InsertAt` of `DropControl`.
/// The site it leaves hears it go first (see `KilnDragDock`). Raises `EInvalidOperation` "%s is not a dock site" when `Site`
/// is not one, or "%s cannot dock into %s, which lies inside it", and then nothing has
/// changed. Controls are named by name, or by class without one.
FK_API void ManualDock(TControl* Control, TWinControl* Site, TControl* DropControl = nullptr,
                       TAlign InsertAt = alNone);
/// Docks `NewControl` in the site of `Control` in its place, and takes `Control` out as a
/// top-level window at its screen rectangle. Raises `EInvalidOperation` "%s is not
/// docked" when `Control` has no site, and then nothing has changed.
FK_API void ReplaceDockedControl(TControl* Control, TControl* NewControl);
/// Takes `Control` out of its site, if any (the site hears it go first), and makes it a top-level window at the
/// screen rectangle `R`.
FK_API void ManualFloat(TControl* Control, const TRect& R);
/// Gives `Site` the manager of its arrangement (null for none).
FK_API void SetDockManager(TWinControl* Site, IPtr<IDockManager> Manager);
FK_API IPtr<IDockManager> DockManager(const TWinControl* Site);

} // namespace formkit
