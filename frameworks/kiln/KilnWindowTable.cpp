//===- frameworks/kiln/KilnWindowTable.cpp - The window table ------------===//
#include "frameworks/kiln/KilnWindowTable.h"

#include <unordered_map>

namespace formkit::detail {

namespace {
/// The table; it hears each control it keeps go, and forgets it.
class TWindowWatcher : public TComponent {
  FK_CLASS(TWindowWatcher, TComponent)
public:
  std::unordered_map<const TControl*, TWindowExtras> Extras;
  TWinControl* Focus = nullptr;

  void SetFocus(TWinControl* Control) {
    if (Control == Focus) return;
    if (Control) FreeNotification(Control);
    if (Focus && !Extras.contains(Focus)) RemoveFreeNotification(Focus);
    Focus = Control;
  }

  TWindowExtras& ExtrasOf(TControl* Control) {
    auto [It, Added] = Extras.try_emplace(Control);
    if (Added) {
      auto Undo = OnFailure([&]() noexcept { Extras.erase(Control); });
      FreeNotification(Control);
    }
    return It->second;
  }

  void Undock(TControl* Control) noexcept {
    auto It = Extras.find(Control);
    if (It == Extras.end() || !It->second.Host) return;
    auto Site = Extras.find(It->second.Host);
    It->second.Host = nullptr;
    if (Site == Extras.end()) return;
    std::erase(Site->second.Clients, Control);
    // The zones go with the client list. This runs where nothing can be reported (a
    // control that goes); a layout that fails there leaves the other clients unmoved.
    if (IPtr<IDockZones> Zones; Supports(Site->second.Manager, Zones))
      RunIgnoringExceptions([&] { Zones->RemoveControl(Control); });
  }

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override {
    inherited::Notification(AComponent, Operation);
    auto* C = dynamic_cast<TControl*>(AComponent);
    if (Operation != opRemove || !C) return;
    if (C == Focus) Focus = nullptr;
    if (!Extras.contains(C)) return;
    Undock(C);
    // Found again: the site's manager lays its zones out on the way, which may add entries.
    auto It = Extras.find(C);
    // A site that goes leaves its clients floating.
    for (TControl* Client : It->second.Clients) Extras[Client].Host = nullptr;
    Extras.erase(It);
  }
};

TWindowWatcher*& WatcherInstance() {
  static TWindowWatcher* W = nullptr;
  return W;
}

TWindowWatcher* Watcher() {
  TWindowWatcher*& W = WatcherInstance();
  if (!W) W = CreateComponentOf<TWindowWatcher>(nullptr);
  return W;
}
} // namespace

FK_IMPLEMENT(TWindowWatcher, "KilnWindows") {}

TWindowExtras& WindowExtrasOf(TControl* Control) { return Watcher()->ExtrasOf(Control); }

const TWindowExtras* FindWindowExtras(const TControl* Control) noexcept {
  TWindowWatcher* W = WatcherInstance();
  if (!W) return nullptr;
  auto It = W->Extras.find(Control);
  return It == W->Extras.end() ? nullptr : &It->second;
}

void UndockFromTable(TControl* Control) noexcept {
  if (TWindowWatcher* W = WatcherInstance()) W->Undock(Control);
}

void SetFocusedControl(TWinControl* Control) { Watcher()->SetFocus(Control); }

TWinControl* FocusedControl() noexcept {
  TWindowWatcher* W = WatcherInstance();
  return W ? W->Focus : nullptr;
}

void FreeWindowTable() noexcept { FreeAndNil(WatcherInstance()); }

} // namespace formkit::detail
