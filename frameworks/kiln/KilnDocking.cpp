//===- frameworks/kiln/KilnDocking.cpp - Dock sites and their clients ----===//
#include "frameworks/kiln/KilnWindowTable.h"

namespace formkit {

FK_RESOURCESTRING(SNotADockSite, "%s is not a dock site");
FK_RESOURCESTRING(SDockIntoOwnSite, "%s cannot dock into %s, which lies inside it");

namespace {
/// A control's name, or its class name when it has none, for messages.
String DisplayName(const TControl* C) {
  if (!C) return "(none)";
  return C->Name().empty() ? C->ClassName() : C->Name();
}
} // namespace

void SetDockSite(TWinControl* Site, bool Value) { detail::WindowExtrasOf(Site).DockSite = Value; }

bool IsDockSite(const TWinControl* Site) noexcept {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Site);
  return S && S->DockSite;
}

TWinControl* HostDockSite(const TControl* Control) noexcept {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Control);
  return S ? S->Host : nullptr;
}

std::vector<TControl*> DockClients(const TWinControl* Site) {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Site);
  return S ? S->Clients : std::vector<TControl*>();
}

void ManualDock(TControl* Control, TWinControl* Site) {
  if (!Site || !IsDockSite(Site)) throw EInvalidOperation(SNotADockSite, DisplayName(Site));
  if (Site->HasAncestor(Control)) throw EInvalidOperation(SDockIntoOwnSite, DisplayName(Control), DisplayName(Site));
  detail::TWindowExtras& Own = detail::WindowExtrasOf(Control);
  if (Own.Host == Site) return;
  detail::TWindowExtras& Target = detail::WindowExtrasOf(Site);
  Target.Clients.reserve(Target.Clients.size() + 1);
  Control->SetParent(Site);
  detail::UndockFromTable(Control);
  Target.Clients.push_back(Control);
  Own.Host = Site;
}

void ManualFloat(TControl* Control, const TRect& R) {
  detail::UndockFromTable(Control);
  Control->SetParent(nullptr);
  Control->SetBoundsRect(R);
}

void SetDockManager(TWinControl* Site, IPtr<IDockManager> Manager) {
  detail::WindowExtrasOf(Site).Manager = std::move(Manager);
}

IPtr<IDockManager> DockManager(const TWinControl* Site) {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Site);
  return S ? S->Manager : nullptr;
}

} // namespace formkit
