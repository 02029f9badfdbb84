//===- desktop/DockHostForms.cpp - The base of dock hosts and their registry ===//
#include "desktop/DockHostForms.h"

#include "desktop/IDEDockPanel.h"
#include "frameworks/kiln/KilnDockTabs.h"

#include <algorithm>

namespace formkit {

namespace detail {
bool CanTakeFocus(const TControl* C) {
  auto* W = dynamic_cast<const TWinControl*>(C);
  return W && W->Visible() && W->Enabled();
}
} // namespace detail

std::vector<TBaseDockHostForm*>& HostDockFormList() {
  static std::vector<TBaseDockHostForm*> List;
  return List;
}

void RegisterDockHostForms() {
  RegisterDockHostClass(dtTab, TTabDockHostForm::StaticClass());
  RegisterDockHostClass(dtJoin, TJoinDockForm::StaticClass());
  RegisterDesktopFormClass(TBaseDockHostForm::StaticClass(), "DockSite", String());
}

void UnregisterDockHostForms() {
  RegisterDockHostClass(dtTab, nullptr);
  RegisterDockHostClass(dtJoin, nullptr);
  UnregisterDesktopFormClass(TBaseDockHostForm::StaticClass());
}

//===----------------------------------------------------------------------===//
// TBaseDockHostForm
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBaseDockHostForm, "DockHostForms") {}

void TBaseDockHostForm::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  OnClose = TCloseEvent::Bind<&TBaseDockHostForm::FormClose>(this);
  SetCaption("Tool Windows");
  HostDockFormList().push_back(this);
}

void TBaseDockHostForm::BeforeDestruction() {
  std::erase(HostDockFormList(), this);
  inherited::BeforeDestruction();
}

bool TBaseDockHostForm::CreateDockParent(TDragDockObject*, std::intptr_t&) { return false; }

void TBaseDockHostForm::SetDockable(bool) {}

TClass TBaseDockHostForm::GetDialogCharParentClass() const { return TDockableForm::StaticClass(); }

TWinControl* TBaseDockHostForm::GetDockSiteControl() { return this; }

void TBaseDockHostForm::CMDialogChar(TMessage& Message) {
  TWinControl* Target = this;
  TControl* Focus = GetFocus();
  if (Focus && Focus != this && Focus->HasAncestor(this))
    for (TControl* C = Focus; C && C != this; C = C->Parent())
      if (auto* W = dynamic_cast<TWinControl*>(C); W && W->InheritsFrom(GetDialogCharParentClass())) Target = W;
  Target->Broadcast(Message);
}

void TBaseDockHostForm::ManualDockClient(TControl* AClient, TControl* ADropControl, TAlign ADropAlign,
                                         bool AIncrement) {
  if (AIncrement && ADropControl)
    ReplaceDockedControl(ADropControl, AClient);
  else
    ManualDock(AClient, GetDockSiteControl(), ADropControl, ADropAlign);
}

void TBaseDockHostForm::ResetCaption() {
  String Text;
  for (TControl* C : DockClients(GetDockSiteControl())) {
    if (!C->Visible()) continue;
    if (!Text.empty()) Text += ", ";
    Text += C->Caption();
  }
  SetCaption(Text);
}

void TBaseDockHostForm::ResetStayOnTop() {
  bool OnTop = false;
  for (TControl* C : DockClients(GetDockSiteControl()))
    if (auto* F = dynamic_cast<TDockableForm*>(C); F && F->Visible() && F->FormStyle() == fsStayOnTop) OnTop = true;
  // Through the form's own switch, which tells this host's host in turn.
  SetStayOnTop(OnTop);
}

int TBaseDockHostForm::GetVisibleClientCount() {
  std::vector<TControl*> Clients = DockClients(GetDockSiteControl());
  return static_cast<int>(std::count_if(Clients.begin(), Clients.end(), [](TControl* C) { return C->Visible(); }));
}

void TBaseDockHostForm::UndockAllClientsAndSelf() {
  std::vector<TControl*> Clients = DockClients(GetDockSiteControl());
  for (auto It = Clients.rbegin(); It != Clients.rend(); ++It) {
    if (auto* D = dynamic_cast<TDesktopForm*>(*It)) D->LockUpdates();
    ManualFloat(*It, ScreenBoundsOf(*It));
  }
  if (Docked()) {
    LockUpdates();
    ManualFloat(this, ScreenBoundsOf(this));
  }
}

void TBaseDockHostForm::FormClose(TObject*, TCloseAction& Action) {
  Action = (!DockClients(GetDockSiteControl()).empty() || FDontReleaseForm) ? caHide : caFree;
}

bool TBaseDockHostForm::DoUnDock(TWinControl* NewTarget, TControl* Client) {
  bool Allowed = !NewTarget || dynamic_cast<TBaseDockHostForm*>(NewTarget) ||
                 dynamic_cast<TEditorDockPanel*>(NewTarget) || dynamic_cast<TDockTabSet*>(NewTarget);
  if (!Allowed) return false;
  return TDockableForm::DoUnDock(NewTarget, Client);
}

void TBaseDockHostForm::PostFinalUndock(TControl* AClient) {
  PostMessage(this, formkit::UMFinalUndock, 0, reinterpret_cast<std::intptr_t>(AClient));
}

void TBaseDockHostForm::RememberUndockedSize(TControl* AClient) {
  ForgetClient(AClient);
  FUndockedSizes.emplace_back(AClient, Point(AClient->Width(), AClient->Height()));
}

void TBaseDockHostForm::UMFinalUndock(TControl*) {
  if (FDontReleaseForm || FDissolving) return;
  FDissolving = true;
  auto* Panel = dynamic_cast<TEditorDockPanel*>(HostDockSite(this));
  if (Panel) Panel->SetResizeSuspended(true);
  auto Resume = Finally([&]() noexcept {
    if (Panel) RunIgnoringExceptions([&] { Panel->SetResizeSuspended(false); });
  });
  std::vector<TControl*> Clients = DockClients(GetDockSiteControl());
  if (TControl* Client = Clients.empty() ? nullptr : Clients.front()) {
    if (Docked()) {
      ReplaceDockedControl(this, Client);
    } else {
      TPoint Size = Point(Client->Width(), Client->Height());
      for (const auto& [C, Undocked] : FUndockedSizes)
        if (C == Client) Size = Undocked;
      ManualFloat(Client, Bounds(Left(), Top(), Size.X, Size.Y));
    }
  }
  ReleaseForm();
}

void TBaseDockHostForm::UMNewClientFocused(TControl* AClient) {
  auto* Client = dynamic_cast<TDockableForm*>(AClient);
  if (FLastFocusedClient && FLastFocusedClient != Client && AClient && AClient->Parent() == GetDockSiteControl())
    SendMessage(FLastFocusedClient, CMDockClientDeactivate, 0, 0);
  FLastFocusedClient = Client;
  if (Client) FreeNotification(Client);
}

void TBaseDockHostForm::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FLastFocusedClient) FLastFocusedClient = nullptr;
}

void TBaseDockHostForm::WndProc(TMessage& Message) {
  switch (Message.Msg) {
  case formkit::UMFinalUndock: UMFinalUndock(reinterpret_cast<TControl*>(Message.LParam)); return;
  case formkit::UMNewClientFocused: UMNewClientFocused(reinterpret_cast<TControl*>(Message.LParam)); return;
  case CM_DIALOGCHAR: CMDialogChar(Message); return;
  default: inherited::WndProc(Message);
  }
}

} // namespace formkit
