//===- desktop/JoinDockHost.cpp - The host of joined tool windows --------===//
#include "desktop/DockHostForms.h"

#include "desktop/PercentageDockTree.h"
#include "frameworks/kiln/KilnWindows.h"

namespace formkit {

using detail::CanTakeFocus;

namespace {
constexpr const char* KeyDockClients = "DockClients";
constexpr const char* KeyDockSiteData = "DockSiteData";
} // namespace

//===----------------------------------------------------------------------===//
// TJoinDockForm
//===----------------------------------------------------------------------===//

/// The dock tree of a join host, which tells the host of a client that left.
class TJoinDockTree : public TPercentageDockTree {
  FK_CLASS(TJoinDockTree, TPercentageDockTree)
public:
  explicit TJoinDockTree(TJoinDockForm* AHost) : TPercentageDockTree(AHost, dcoHorizontal), FHost(AHost) {}
  void InsertControl(TControl* Control, TAlign InsertAt, TControl* DropControl) override {
    if (!InfoOf(Control)) FHost->RememberUndockedSize(Control);
    TPercentageDockTree::InsertControl(Control, InsertAt, DropControl);
  }
  void RemoveControl(TControl* Control) override {
    // The framework removes a leaving client twice; only the first time counts.
    bool Known = InfoOf(Control) != nullptr;
    TPercentageDockTree::RemoveControl(Control);
    if (Known) FHost->ClientLeft(Control);
  }

private:
  TJoinDockForm* FHost;
};
FK_IMPLEMENT(TJoinDockTree, "DockHostForms") {}

FK_IMPLEMENT(TJoinDockForm, "DockHostForms") {}

void TJoinDockForm::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetDragKind(dkDrag);
  SetDragMode(dmManual);
  SetDockManager(this, New<TJoinDockTree>(this));
}

void TJoinDockForm::ClientLeft(TControl* AClient) {
  ForgetClient(AClient);
  if (ComponentState().Contains(csDestroying) || Dissolving()) return;
  std::vector<TControl*> Clients = DockClients(this);
  std::erase(Clients, AClient);
  if (Clients.size() != 1) return;
  auto* D = dynamic_cast<TDockableForm*>(AClient);
  bool Going = D ? D->AboutToDestroy() : AClient->ComponentState().Contains(csDestroying);
  PostFinalUndock(Going ? nullptr : AClient);
  if (!Going && CanTakeFocus(AClient)) SetFocus(static_cast<TWinControl*>(AClient));
}

void TJoinDockForm::SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) {
  if (!ADesktop || DockClients(this).empty()) return;
  inherited::SaveWindowState(ADesktop, AIsProject);
  SaveDockClients(ADesktop, AIsProject, KeyDockClients, this);
  SaveDockStream(ADesktop, KeyDockSiteData, this);
}

void TJoinDockForm::LoadWindowState(TCustomIniFile* ADesktop) {
  if (!ADesktop) return;
  inherited::LoadWindowState(ADesktop);
  if (!LoadDockClients(ADesktop, KeyDockClients, this)) Abort();
  LoadDockStream(ADesktop, KeyDockSiteData, this);
}

void TJoinDockForm::UnlockUpdates() {
  if (IPtr<IDockZones> Zones; Supports(DockManager(this), Zones)) Zones->ResetBounds(true);
  inherited::UnlockUpdates();
}

void TJoinDockForm::CMDockNotification(TControl* Client, TDockNotifyKind Kind) {
  inherited::CMDockNotification(Client, Kind);
  ResetCaption();
  if (Kind != TDockNotifyKind::VisibleChanged) return;
  ResetStayOnTop();
  if (GetVisibleClientCount() == 1 && !Client->Visible()) PostFinalUndock(nullptr);
  if (GetVisibleClientCount() == 0) Hide();
}

TControl* TJoinDockForm::ReloadDockedControl(const String& Name) {
  for (int I = 0; I < ControlCount(); ++I)
    if (CompareText(Controls(I)->Name(), Name) == 0) return Controls(I);
  return nullptr;
}

} // namespace formkit
