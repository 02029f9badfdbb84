//===- frameworks/kiln/KilnDockTabs.h - A strip of tabs for docked clients ===//
//
// `TDockTabSet` is a dock site that shows its clients as tabs: each client
// that docks gets the next tab and (when it auto-hides) is hidden until its
// tab is chosen. Tab positions can be set past the end, which leaves empty
// ("dead") tabs until they are deleted; a client that leaves takes its tab
// with it.
//
// Example:
//   auto* Strip = CreateComponentOf<TDockTabSet>(Form);
//   ManualDock(Messages, Strip);     // tab 0, hidden
//   Strip->SelectTab(0);             // shown through ShowDockClientInfo
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDragDock.h"
#include "frameworks/kiln/KilnGraphics.h"

#include <memory>

namespace formkit {

/// What a tab set keeps of one docked client; owned by the tab set.
struct TTabDockClientInfo {
  TControl* Control = nullptr;
  int TabIndex = -1;
};

/// A dock site whose clients are tabs.
class FK_API TDockTabSet : public TCustomControl, public TDockHandler {
  FK_CLASS(TDockTabSet, TCustomControl)
public:
  /// A dock site with the manager that turns clients into tabs.
  void Create(TComponent* AOwner) override;

  /// The number of tabs, dead ones included.
  int TabCount() const noexcept { return static_cast<int>(FSlots.size()); }
  /// The text of a tab: `GetTabName` of its client, empty for a dead tab. Raises
  /// `EListError` when out of range.
  String Tabs(int Index);
  /// The client on a tab, or null for a dead one.
  TControl* TabClient(int Index) const;
  /// Removes a tab; a client on it loses its tab index (-1). Raises `EListError`.
  void DeleteTab(int Index);
  /// The information of a docked client, or null.
  TTabDockClientInfo* GetClientInfo(const TControl* AClient) const noexcept;
  /// Moves a client to tab `Index`, adding dead tabs up to it; a client already there
  /// takes the client's old place. Raises `EListError` for a negative index.
  void SetTabIndex(TTabDockClientInfo* AInfo, int Index);
  /// Shows the client of tab `Index` through `ShowDockClientInfo`; nothing on a dead tab.
  void SelectTab(int Index);
  /// The client last shown, or null.
  TControl* ShownClient() const noexcept { return FShownClient; }

  /// The text of a client's tab: its caption, or its name without one.
  virtual String GetTabName(TControl* AClient);
  /// Whether a client is hidden while another tab is chosen; true by default.
  virtual bool ShouldAutoHide(TControl* AClient);
  /// Shows the client of `AInfo`.
  virtual void ShowDockClientInfo(TTabDockClientInfo* AInfo);
  /// Writes each tab's text, left to right.
  void Paint(TCanvas* Canvas) override;

private:
  friend class TDockTabManager;
  void ClientDocked(TControl* AClient);
  void ClientLeft(TControl* AClient) noexcept;
  std::vector<std::unique_ptr<TTabDockClientInfo>> FInfos;
  /// The client of each tab, null for a dead tab.
  std::vector<TControl*> FSlots;
  TControl* FShownClient = nullptr;
};

} // namespace formkit
