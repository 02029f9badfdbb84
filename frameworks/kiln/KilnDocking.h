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

/// Makes a windowed control a place where others dock, or no longer one.
FK_API void SetDockSite(TWinControl* Site, bool Value);
FK_API bool IsDockSite(const TWinControl* Site) noexcept;
/// The site a control is docked in, or null when it floats.
FK_API TWinControl* HostDockSite(const TControl* Control) noexcept;
/// The controls docked in `Site`, in the order they docked.
FK_API std::vector<TControl*> DockClients(const TWinControl* Site);
/// Docks `Control` into `Site` as its last client, out of any site it was in: it becomes
/// a child of the site. Raises `EInvalidOperation` "%s is not a dock site" when `Site`
/// is not one, or "%s cannot dock into %s, which lies inside it", and then nothing has
/// changed. Controls are named by name, or by class without one.
FK_API void ManualDock(TControl* Control, TWinControl* Site);
/// Takes `Control` out of its site, if any, and makes it a top-level window at the
/// screen rectangle `R`.
FK_API void ManualFloat(TControl* Control, const TRect& R);
/// Gives `Site` the manager of its arrangement (null for none).
FK_API void SetDockManager(TWinControl* Site, IPtr<IDockManager> Manager);
FK_API IPtr<IDockManager> DockManager(const TWinControl* Site);

} // namespace formkit
