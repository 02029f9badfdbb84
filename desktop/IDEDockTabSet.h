//===- desktop/IDEDockTabSet.h - The auto-hide strip of tool windows -----===//
//
// `TIDEDockTabSet` is the strip that holds tool windows pinned away. It keeps
// its windows in the desktop as "section=tab" entries and brings them back in
// their tabs, closing the gaps left by windows that did not come back.
//
// Example:
//   Strip->SaveState(Desktop, false, "BottomTabs", EditWindow);   // BottomTabs=a=0,b=1
//   Strip->LoadState(Desktop, "BottomTabs", EditWindow);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/DeskForm.h"
#include "frameworks/kiln/KilnDockTabs.h"

namespace formkit {

/// The environment's strip of pinned-away tool windows.
class FK_API TIDEDockTabSet : public TDockTabSet {
  FK_CLASS(TIDEDockTabSet, TDockTabSet)
public:
  /// True while `LoadState` runs.
  bool UpdatesDisabled() const noexcept { return FUpdatesDisabled; }
  /// Writes "section=tab" of each client with a tab, joined by ",", under
  /// `ClientSection` in the section of `DesktopForm`; nothing for an empty strip.
  void SaveState(TCustomIniFile* Desktop, bool IsProject, const String& ClientSection, TDesktopForm* DesktopForm);
  /// Floats the clients there, docks the windows the entry names (found among the loaded
  /// desktop windows) at their tabs, loads and hides them, then closes the gaps.
  void LoadState(TCustomIniFile* Desktop, const String& ClientSection, TDesktopForm* DesktopForm);
  /// Makes the tab indices dense: clients past the end take the lowest free tabs, and
  /// the tabs beyond the clients go.
  void RemoveDeadTabs();

  /// The visible clients' captions, joined by ", ", for a tab host; "Untitled" for an
  /// empty name.
  String GetTabName(TControl* AClient) override;
  /// True for a client that is no desktop window, else the window's own answer.
  bool ShouldAutoHide(TControl* AClient) override;
  /// Nothing while loading or while the desktop service batches updates.
  void ShowDockClientInfo(TTabDockClientInfo* AInfo) override;

private:
  bool FUpdatesDisabled = false;
};

} // namespace formkit
