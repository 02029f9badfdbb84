//===- frameworks/kiln/KilnDocking.cpp - Dock sites and their clients ----===//
#include "frameworks/kiln/KilnDragDock.h"
#include "frameworks/kiln/KilnWindowTable.h"

namespace formkit {

FK_RESOURCESTRING(SNotADockSite, "%s is not a dock site");
FK_RESOURCESTRING(SNotDocked, "%s is not docked");
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

void ManualDock(TControl* Control, TWinControl* Site, TControl* DropControl, TAlign InsertAt) {
  if (!Site || !IsDockSite(Site)) throw EInvalidOperation(SNotADockSite, DisplayName(Site));
  if (Site->HasAncestor(Control)) throw EInvalidOperation(SDockIntoOwnSite, DisplayName(Control), DisplayName(Site));
  detail::TWindowExtras& Own = detail::WindowExtrasOf(Control);
  if (Own.Host == Site) {
    // Docked again in the same site: only a new place among its zones.
    if (IPtr<IDockZones> Zones; DropControl && Supports(DockManager(Site), Zones))
      Zones->InsertControl(Control, InsertAt, DropControl);
    return;
  }
  detail::TWindowExtras& Target = detail::WindowExtrasOf(Site);
  Target.Clients.reserve(Target.Clients.size() + 1);
  detail::SendUndockClient(Control, Site);
  Control->SetParent(Site);
  detail::UndockFromTable(Control);
  Target.Clients.push_back(Control);
  Own.Host = Site;
  if (IPtr<IDockZones> Zones; Supports(Target.Manager, Zones)) Zones->InsertControl(Control, InsertAt, DropControl);
}

void ReplaceDockedControl(TControl* Control, TControl* NewControl) {
  TWinControl* Site = HostDockSite(Control);
  if (!Site) throw EInvalidOperation(SNotDocked, DisplayName(Control));
  TRect Where = ScreenBoundsOf(Control);
  ManualDock(NewControl, Site);
  if (IPtr<IDockZones> Zones; Supports(DockManager(Site), Zones)) Zones->ReplaceControl(Control, NewControl);
  ManualFloat(Control, Where);
}

void ManualFloat(TControl* Control, const TRect& R) {
  detail::SendUndockClient(Control, nullptr);
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
