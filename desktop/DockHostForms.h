//===- desktop/DockHostForms.h - Hosts of tabbed and joined tool windows -===//
//
// When a tool window is dropped on another, the two move into a host made for
// them: a `TTabDockHostForm` stacks its clients behind a strip of tabs, a
// `TJoinDockForm` lays them side by side in a dock tree. A host is itself a
// dockable form and is saved in the desktop with the sections of its clients.
// It lives while it holds two clients at least: when one is left, a posted
// `UMFinalUndock` puts that client in the host's place and frees the host.
//
// Example:
//   InitializeDesktop();                 // drops now make these hosts
//   TDockDrag Drag(Watches);
//   Drag.MoveTo(Center(Messages));
//   Drag.Drop();                         // a tab host with both
//   Watches->Close();                    // ... and after the next message cycle,
//   ProcessMessages();                   // Messages floats where the host was
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/DockForm.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnTabSet.h"

#include <memory>
#include <vector>

namespace formkit {

/// Messages of dock hosts.
enum : std::uint32_t {
  /// Sent to a host when one of its clients got the focus; the argument is the client.
  UMNewClientFocused = 1287,
  /// The framework's message to a client that lost its place as the focused client
  /// (a number of the framework's own list, so that it meets no other message).
  CMDockClientDeactivate = CM_DEACTIVATE,
};

class TBaseDockHostForm;
class TTabDockHostForm;

namespace detail {
/// A windowed control that is visible and enabled.
FK_API bool CanTakeFocus(const TControl* C);
} // namespace detail

/// Every tab and join host that exists, in the order they were made; not owned.
FK_API std::vector<TBaseDockHostForm*>& HostDockFormList();

/// Makes drops create `TTabDockHostForm` and `TJoinDockForm`, and registers the host
/// class for the desktop section "DockSite"; `InitializeDesktop` calls it.
/// `UnregisterDockHostForms` undoes it.
FK_API void RegisterDockHostForms();
FK_API void UnregisterDockHostForms();

//===----------------------------------------------------------------------===//
// TBaseDockHostForm
//===----------------------------------------------------------------------===//

/// The base of the forms that hold docked tool windows.
class FK_API TBaseDockHostForm : public TDockableForm, public TDockHostLink {
  FK_CLASS(TBaseDockHostForm, TDockableForm)
public:
  /// Joins `HostDockFormList`; the close action follows `FormClose`.
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  TDockableForm* LastFocusedClient() const noexcept { return FLastFocusedClient; }
  int HostDockNumber() const noexcept { return FHostDockNumber; }
  void SetHostDockNumber(int Value) noexcept { FHostDockNumber = Value; }
  /// True keeps the host alive, hidden, when its clients leave it.
  bool DontReleaseForm() const noexcept { return FDontReleaseForm; }
  void SetDontReleaseForm(bool Value) noexcept { FDontReleaseForm = Value; }

  /// A host never makes a host around itself: the client goes straight in.
  bool CreateDockParent(TDragDockObject* Source, std::intptr_t& Result) override;
  /// A host is always dockable.
  void SetDockable(bool AValue) override;
  /// The class at which the walk of a dialog character up from the focused control
  /// stops: a client window of the host.
  virtual TClass GetDialogCharParentClass() const;
  /// The control clients dock into: the form itself.
  virtual TWinControl* GetDockSiteControl();
  /// With `AIncrement`, `AClient` takes the place of `ADropControl`; otherwise it docks
  /// here at `ADropAlign` of `ADropControl`.
  void ManualDockClient(TControl* AClient, TControl* ADropControl, TAlign ADropAlign, bool AIncrement) override;
  /// The captions of the visible clients joined with ", ".
  virtual void ResetCaption();
  /// Stays on top exactly when a visible client does; then its own host checks again.
  void ResetStayOnTop() override;
  /// The clients whose `Visible` is true.
  int GetVisibleClientCount();
  /// Floats every client, from the last, and then this host when it is docked.
  void UndockAllClientsAndSelf();
  /// Hides while clients remain or `DontReleaseForm` holds; frees otherwise.
  void FormClose(TObject* Sender, TCloseAction& Action);
  /// Refuses (false) a drop target that is no host, editor dock panel or dock tab set.
  bool DoUnDock(TWinControl* NewTarget, TControl* Client) override;

protected:
  void WndProc(TMessage& Message) override;
  void Notification(TComponent* AComponent, TOperation Operation) override;
  /// Ends the host: its first client takes its place, docked or floating, and the
  /// host is released. Nothing with `DontReleaseForm`.
  virtual void UMFinalUndock(TControl* AClient);
  /// Tells the previously focused client, when it differs, that it lost its place.
  void UMNewClientFocused(TControl* AClient);
  /// Hands a dialog character to the client window that holds the focus (the outermost
  /// control of class `GetDialogCharParentClass` around it, below the host), or to all
  /// clients when the focus is elsewhere, until one takes it.
  virtual void CMDialogChar(TMessage& Message);
  /// Posts `UMFinalUndock` once; later requests wait for it.
  void PostFinalUndock(TControl* AClient);
  /// Whether `UMFinalUndock` is moving the last client out.
  bool Dissolving() const noexcept { return FDissolving; }
  /// Keeps the size a client had before it docked here, which it floats with when it is
  /// the last; `ForgetClient` drops it when the client leaves.
  void RememberUndockedSize(TControl* AClient);
  void ForgetClient(TControl* AClient) noexcept {
    std::erase_if(FUndockedSizes, [&](const auto& E) { return E.first == AClient; });
  }

private:
  std::vector<std::pair<TControl*, TPoint>> FUndockedSizes;
  TDockableForm* FLastFocusedClient = nullptr;
  std::int32_t FHostDockNumber = -1;
  bool FDontReleaseForm = false;
  bool FDissolving = false;
};

//===----------------------------------------------------------------------===//
// TTabDockHostForm
//===----------------------------------------------------------------------===//

/// One client of a tab host: its tab, and the panel that holds it. Owned by the host.
class FK_API TTabDockInfo : public TObject {
  FK_CLASS(TTabDockInfo, TObject)
public:
  TTabDockInfo(TTabDockHostForm* AForm, TControl* AClient);
  /// Frees the panel; takes the tab away unless the strip is going too.
  void BeforeDestruction() override;

  int TabIndex() const noexcept { return FTabIndex; }
  TControl* DockClient() const noexcept { return FDockClient; }
  /// The panel that holds the client; owned; null before the first need.
  TPanel* TabSheet() const noexcept { return FTabSheet.Get(); }

  /// Makes the panel, a child of the host's page area, and puts the client in it.
  void CreateTabSheet();
  /// Appends a tab with the client's caption when there is none, and shows the strip.
  void CreateTab();
  /// Takes the tab away; the tabs after it move one down.
  void RemoveTab();
  /// Moves the tab to `AIndex`, the others closing up, appending empty tabs up to it.
  void SetTabIndex(int AIndex);
  void BeginDragging() noexcept { FOriginalIndex = FTabIndex; }
  void EndDragging();
  /// Gives the client a tab when it has none and selects it.
  void ShowClient();
  /// Brings the client's page to the front and takes its help over.
  void SetActive();
  /// Takes the client out of the panel and frees the panel.
  void RemoveDockClient();

private:
  friend class TTabDockHostForm;
  std::int32_t FTabIndex = -1;
  TControl* FDockClient;
  TTabDockHostForm* FForm;
  TObjectGuard<TPanel> FTabSheet;
  std::int32_t FOriginalIndex = -1;
};

/// A host whose clients stand behind a strip of tabs, one page in front.
class FK_API TTabDockHostForm : public TBaseDockHostForm {
  FK_CLASS(TTabDockHostForm, TBaseDockHostForm)
public:
  /// Makes the page area, the strip and its menu of positions.
  void Create(TComponent* AOwner) override;
  /// Clears the strip's objects, then frees the infos.
  void BeforeDestruction() override;

  TIDEDockType HostDockType() const override { return dtTab; }
  TPanel* DockPanel() const noexcept { return FDockPanel; }
  TTabSet* DockTab() const noexcept { return FDockTab; }
  TPopupMenu* TabPosPopupMenu() const noexcept { return FTabPosPopupMenu; }
  /// The menu items "&Top", "&Bottom", "&Left", "&Right", "-", "&Hide".
  TMenuItem* MenuItem(int Index) const;
  TPanel* ActivePage() const noexcept { return FActivePage; }
  /// The clients in the host, in the order of the list (which a save sorts by tab).
  int DockInfoCount() const noexcept { return static_cast<int>(FDockInfos.size()); }
  TTabDockInfo* DockInfo(int Index) const { return FDockInfos.at(static_cast<std::size_t>(Index)).Get(); }

  /// The info of a client; null when it is none of this host's.
  TTabDockInfo* GetDockClientInfo(TControl* AClient) const noexcept;
  /// The info on a tab; null for -1.
  TTabDockInfo* GetDockClientInfoFromTab(int AIndex) const;
  /// Gives the client a tab when it has none and selects it.
  void ShowDockClient(TControl* AClient);
  /// Places the strip at a side of the host.
  void SetDockTabPosition(TTabPosition APosition);
  /// The text of a form, or "Untitled Window".
  static String GetClientCaption(TControl* AClient);
  /// The selected tab's caption.
  void ResetCaption() override;

  // Handlers ---------------------------------------------------------------------
  /// Any of the four position items: checks it and moves the strip to its tag.
  void mnuTopClick(TObject* Sender);
  /// Remembers the tab at `AScreenPos` for `mnuHideTabClick`, selects it, and checks the
  /// item of the strip's side.
  void TabPosPopupMenuPopup(TPoint AScreenPos);
  /// Hides the remembered tab's client.
  void mnuHideTabClick(TObject* Sender);
  /// Brings the selected tab's page to the front.
  void DockTabClick(TObject* Sender);
  /// A button went down on the strip at `P` (strip coordinates): selects the tab there,
  /// and with the left button remembers it for a drag.
  void DockTabMouseDown(TMouseButton Button, TPoint P);
  /// Past `DragThreshold` from the press, the remembered tab's client starts a dock
  /// drag; while it runs, the drag follows the mouse.
  void DockTabMouseMove(TPoint P);
  /// Forgets the pressed tab; a running drag drops where the mouse is.
  void DockTabMouseUp(TPoint P);
  /// The dock drag a tab started, until the next press; owned.
  TDockDrag* TabDrag() const noexcept { return FTabDrag.get(); }

  // Docking ------------------------------------------------------------------------
  /// Only forms other than the source editor, over the strip when it shows.
  void GetSiteInfo(TControl* Client, TRect& InfluenceRect, TPoint MousePos, bool& CanDock) override;
  /// Over a showing strip: a drop would be a tab at the point, and the tab of the
  /// dragged window moves there as the mouse does; leaving puts the tabs back.
  void DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) override;
  /// A drop that only moved a tab of this host's own client docks nothing.
  void CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result) override;
  /// Sets the client's alignment free after the framework's step.
  void CMUnDockClient(TControl* Client, TWinControl* NewTarget) override;
  /// Visibility of a client: a tab comes or goes with it. Its caption: the tab's text,
  /// and the host's when the tab is selected.
  void CMDockNotification(TControl* Client, TDockNotifyKind Kind) override;
  /// Passes a dialog character to the page area, where the client in front takes it.
  void CMDialogChar(TMessage& Message) override;
  /// `ASection` names a client here: `ANewClient` takes its tab and page, and it moves
  /// to `ANewHost`; false when it is no client of this host.
  bool DockReplaceDockClient(TControl* AClient, TWinControl* ANewHost, TControl* ANewClient);

  /// Saves "TabPosition", "ActiveTabID" and "TabDockClients" (sorted by tab) when the
  /// host has clients.
  void SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) override;
  /// Docks the clients named by "TabDockClients" and selects "ActiveTabID" (or the
  /// older "ActiveTab"); aborts silently without clients.
  void LoadWindowState(TCustomIniFile* ADesktop) override;
  /// Leaves the batch, then brings the selected tab's page forward: tab clicks of a
  /// floating host wait while it is in the batch of a desktop load.
  void UnlockUpdates() override;

private:
  friend class TTabDockInfo;
  friend class TTabDockManager;
  void DoAddDockClient(TControl* AClient);
  void DoRemoveDockClient(TControl* AClient);
  void ChangeActivePage(TPanel* APanel);
  void UpdateStripVisibility();
  TTabDockInfo* SelectedInfo() const;
  /// The index a drop at `X`, `Y` (client coordinates) gives the dragged tab.
  int DropTabIndex(int X, int Y) const;
  void EndStripDrag();
  TPanel* FDockPanel = nullptr;
  TTabSet* FDockTab = nullptr;
  TPopupMenu* FTabPosPopupMenu = nullptr;
  std::vector<TMenuItem*> FMenuItems;
  TPanel* FActivePage = nullptr;
  std::vector<TObjectGuard<TTabDockInfo>> FDockInfos;
  TTabDockInfo* FDraggingInfo = nullptr;
  TTabDockInfo* FDownDockInfo = nullptr;
  TPoint FDownPos;
  std::unique_ptr<TDockDrag> FTabDrag;
  std::int32_t FItemToHide = -1;
  std::int32_t FOriginalIndex = -1;
  TWinControl* FUndockTarget = nullptr;
  bool FDestroying = false;
};

//===----------------------------------------------------------------------===//
// TJoinDockForm
//===----------------------------------------------------------------------===//

/// A host whose clients stand side by side in a dock tree.
class FK_API TJoinDockForm : public TBaseDockHostForm {
  FK_CLASS(TJoinDockForm, TBaseDockHostForm)
public:
  void Create(TComponent* AOwner) override;
  TIDEDockType HostDockType() const override { return dtJoin; }
  /// Saves "DockClients" and "DockSiteData" when the host has clients.
  void SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) override;
  /// Docks the clients of "DockClients" and lays them out from "DockSiteData"; aborts
  /// silently without clients.
  void LoadWindowState(TCustomIniFile* ADesktop) override;
  /// Lays the tree out again, then leaves the batch.
  void UnlockUpdates() override;
  /// The host's caption follows its clients; with one visible client left the host ends,
  /// and with none it hides.
  void CMDockNotification(TControl* Client, TDockNotifyKind Kind) override;
  /// The child control of that name.
  TControl* ReloadDockedControl(const String& Name) override;

private:
  friend class TJoinDockTree;
  /// A client left the tree; with one left, the host ends after the message cycle.
  void ClientLeft(TControl* AClient);
};

} // namespace formkit
