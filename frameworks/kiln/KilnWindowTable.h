//===- frameworks/kiln/KilnWindowTable.h - What the window manager keeps -===//
//
// For the framework's own units: the state a window manager keeps of a control
// beyond its bounds (hidden on the screen, redraw switched off, invalidations,
// docking, the focus). An entry is made on first use and goes with its control,
// which a watcher component hears go.
//
// Example:
//   detail::WindowExtrasOf(Panel).RedrawOff = true;
//   const detail::TWindowExtras* E = detail::FindWindowExtras(Panel);   // null if never used
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDocking.h"

namespace formkit::detail {

/// What is kept of one control.
struct TWindowExtras {
  bool WindowHidden = false;
  bool RedrawOff = false;
  int Invalidations = 0;
  bool DockSite = false;
  TWinControl* Host = nullptr;
  std::vector<TControl*> Clients;
  IPtr<IDockManager> Manager;
  /// The size remembered for docking along an edge; 0 while none is.
  int LRDockWidth = 0;
  int TBDockHeight = 0;
};

/// The entry of `Control`, made on first use.
TWindowExtras& WindowExtrasOf(TControl* Control);
/// The entry of `Control`, or null when none was made.
const TWindowExtras* FindWindowExtras(const TControl* Control) noexcept;
/// Takes `Control` out of the client list of its site.
void UndockFromTable(TControl* Control) noexcept;
/// The focused control, kept until it goes.
void SetFocusedControl(TWinControl* Control);
TWinControl* FocusedControl() noexcept;
/// Forgets everything (the framework stops).
void FreeWindowTable() noexcept;

} // namespace formkit::detail
