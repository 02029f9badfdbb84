//===- desktop/TabDockHost.cpp - The host of tabbed tool windows ---------===//
#include "desktop/DockHostForms.h"
#include "desktop/DeskUtil.h"

#include "frameworks/kiln/KilnWindows.h"

#include <algorithm>
#include <climits>
#include <cstdlib>

namespace formkit {

using detail::CanTakeFocus;

namespace {
constexpr const char* KeyTabPosition = "TabPosition";
constexpr const char* KeyActiveTabID = "ActiveTabID";
constexpr const char* KeyActiveTab = "ActiveTab";
constexpr const char* KeyTabDockClients = "TabDockClients";
/// The class of the source editor's window, which never goes into a tab.
constexpr const char* EditWindowClass = "TEditWindow";

/// The alignment of the strip at each tab position.
constexpr TAlign StripAligns[] = {alTop, alBottom, alLeft, alRight};

bool IsEditWindow(const TControl* C) { return C && CompareText(C->ClassName(), EditWindowClass) == 0; }

/// Whether `Inner` is `Outer` or lies inside it.
bool Within(const TControl* Inner, const TControl* Outer) {
  for (const TControl* C = Inner; C; C = C->Parent())
    if (C == Outer) return true;
  return false;
}

} // namespace

//===----------------------------------------------------------------------===//
// TTabDockInfo
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TTabDockInfo, "DockHostForms") {}

TTabDockInfo::TTabDockInfo(TTabDockHostForm* AForm, TControl* AClient) : FDockClient(AClient), FForm(AForm) {}

void TTabDockInfo::BeforeDestruction() {
  FTabSheet.Reset();
  if (!FForm->FDestroying) RemoveTab();
  inherited::BeforeDestruction();
}

void TTabDockInfo::CreateTabSheet() {
  if (FTabSheet) return;
  FTabSheet.Reset(CreateComponentOf<TPanel>(nullptr));
  FTabSheet->SetBevelOuter(bvNone);
  FTabSheet->Hide();
  FTabSheet->SetParent(FForm->FDockPanel);
  FTabSheet->SetAlign(alClient);
  FDockClient->SetParent(FTabSheet.Get());
  FDockClient->SetAlign(alClient);
}

void TTabDockInfo::CreateTab() {
  if (FTabIndex != -1) return;
  FTabIndex = FForm->FDockTab->AddTab(TTabDockHostForm::GetClientCaption(FDockClient), this);
  FForm->FDockTab->Show();
}

void TTabDockInfo::RemoveTab() {
  if (FTabIndex == -1) return;
  for (auto& Info : FForm->FDockInfos)
    if (Info.Get() != this && Info->FTabIndex > FTabIndex) --Info->FTabIndex;
  FForm->FDockTab->DeleteTab(FTabIndex);
  FTabIndex = -1;
}

void TTabDockInfo::SetTabIndex(int AIndex) {
  if (AIndex == FTabIndex) return;
  for (auto& Info : FForm->FDockInfos) {
    int& I = Info->FTabIndex;
    if (Info.Get() == this || I == -1) continue;
    if (I > FTabIndex && I <= AIndex)
      --I;
    else if (I >= AIndex && I < FTabIndex)
      ++I;
  }
  TTabSet* Strip = FForm->FDockTab;
  while (AIndex >= Strip->TabCount()) Strip->AddTab(String(), nullptr);
  Strip->MoveTab(FTabIndex, AIndex);
  FTabIndex = AIndex;
}

void TTabDockInfo::EndDragging() {
  if (FOriginalIndex != -1) SetTabIndex(FOriginalIndex);
}

void TTabDockInfo::ShowClient() {
  if (FTabIndex == -1) {
    CreateTab();
    if (CanTakeFocus(FDockClient)) SetFocus(static_cast<TWinControl*>(FDockClient));
  }
  FForm->FDockTab->SetTabIndex(FTabIndex);
}

void TTabDockInfo::SetActive() {
  if (!FTabSheet) return;
  FTabSheet->Show();
  FForm->ChangeActivePage(FTabSheet.Get());
  auto* Client = dynamic_cast<TCustomForm*>(FDockClient);
  if (!Client) return;
  FForm->SetHelpContext(Client->HelpContext());
  FForm->SetHelpKeyword(Client->HelpContext() != 0 ? String() : Client->HelpKeyword());
}

void TTabDockInfo::RemoveDockClient() {
  RemoveTab();
  if (FTabSheet && FDockClient->Parent() == FTabSheet.Get()) FDockClient->SetParent(nullptr);
  FDockClient = nullptr;
  FTabSheet.Reset();
}

//===----------------------------------------------------------------------===//
// TTabDockHostForm
//===----------------------------------------------------------------------===//

/// Tells the tab host of each client that docks or leaves.
class TTabDockManager : public TInterfacedObject, public IDockManager, public IDockZones {
  FK_CLASS(TTabDockManager, TInterfacedObject)
  FK_INTERFACES(IDockManager, IDockZones)
public:
  explicit TTabDockManager(TTabDockHostForm* AHost) : FHost(AHost) {}
  void InsertControl(TControl* Control, TAlign, TControl*) override {
    if (!FHost->GetDockClientInfo(Control)) FHost->DoAddDockClient(Control);
  }
  void RemoveControl(TControl* Control) override {
    if (FHost->GetDockClientInfo(Control)) FHost->DoRemoveDockClient(Control);
  }
  void ReplaceControl(TControl* Control, TControl* NewControl) override {
    FHost->DockReplaceDockClient(Control, nullptr, NewControl);
  }
  void ResetBounds(bool) override {}
  /// The order of the clients is saved as sections, not as bytes.
  void SaveToStream(TStream*) override {}
  void LoadFromStream(TStream*) override {}

private:
  TTabDockHostForm* FHost;
};
FK_IMPLEMENT(TTabDockManager, "DockHostForms") {}

FK_IMPLEMENT(TTabDockHostForm, "DockHostForms") {}

void TTabDockHostForm::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetAllowAdjustPosForDPI(true);
  FDockPanel = CreateComponentOf<TPanel>(this);
  FDockPanel->SetName("DockPanel");
  FDockPanel->SetBevelOuter(bvNone);
  FDockPanel->SetParent(this);
  FDockPanel->SetAlign(alClient);
  FDockTab = CreateComponentOf<TTabSet>(this);
  FDockTab->SetName("DockTab");
  FDockTab->SetParent(this);
  FDockTab->SetAlign(alBottom);
  FDockTab->SetHeight(28);
  FDockTab->SetTabHeight(24);
  FDockTab->Hide();
  FDockTab->OnClick = TNotifyEvent::Bind<&TTabDockHostForm::DockTabClick>(this);
  FTabPosPopupMenu = CreateComponentOf<TPopupMenu>(this);
  FTabPosPopupMenu->SetName("TabPosPopupMenu");
  struct TEntry {
    const char* Name;
    const char* Caption;
    int Tag;
  };
  static constexpr TEntry Entries[] = {{"mnuTop", "&Top", 0},     {"mnuBottom", "&Bottom", 1},
                                       {"mnuLeft", "&Left", 2},   {"mnuRight", "&Right", 3},
                                       {"N2", "-", 0},            {"mnuHideTab", "&Hide", 0}};
  for (const TEntry& E : Entries) {
    auto* Item = CreateComponentOf<TMenuItem>(this);
    Item->SetName(E.Name);
    Item->SetCaption(E.Caption);
    Item->SetTag(E.Tag);
    FTabPosPopupMenu->Items()->Add(Item);
    FMenuItems.push_back(Item);
  }
  for (std::size_t I = 0; I < 4; ++I) FMenuItems[I]->OnClick = TNotifyEvent::Bind<&TTabDockHostForm::mnuTopClick>(this);
  FMenuItems[0]->SetChecked(true);
  FMenuItems[5]->OnClick = TNotifyEvent::Bind<&TTabDockHostForm::mnuHideTabClick>(this);
  SetDockManager(this, New<TTabDockManager>(this));
}

void TTabDockHostForm::BeforeDestruction() {
  FDestroying = true;
  FTabDrag.reset();
  FDownDockInfo = nullptr;
  // The strip must hold no pointer into the infos once they are freed.
  for (int I = 0; I < FDockTab->TabCount(); ++I) FDockTab->SetTabObject(I, nullptr);
  std::vector<TObjectGuard<TTabDockInfo>> Infos = std::move(FDockInfos);
  FDockInfos.clear();
  Infos.clear();
  SetDockManager(this, nullptr);
  inherited::BeforeDestruction();
}

TMenuItem* TTabDockHostForm::MenuItem(int Index) const { return FMenuItems.at(static_cast<std::size_t>(Index)); }

TTabDockInfo* TTabDockHostForm::GetDockClientInfo(TControl* AClient) const noexcept {
  if (!AClient) return nullptr;
  for (const auto& Info : FDockInfos)
    if (Info->FDockClient == AClient) return Info.Get();
  return nullptr;
}

TTabDockInfo* TTabDockHostForm::GetDockClientInfoFromTab(int AIndex) const {
  if (AIndex == -1) return nullptr;
  return static_cast<TTabDockInfo*>(FDockTab->TabObject(AIndex));
}

TTabDockInfo* TTabDockHostForm::SelectedInfo() const { return GetDockClientInfoFromTab(FDockTab->TabIndex()); }

void TTabDockHostForm::ShowDockClient(TControl* AClient) {
  if (TTabDockInfo* Info = GetDockClientInfo(AClient)) Info->ShowClient();
}

void TTabDockHostForm::SetDockTabPosition(TTabPosition APosition) {
  FDockTab->SetTabPosition(APosition);
  FDockTab->SetAlign(StripAligns[APosition]);
}

String TTabDockHostForm::GetClientCaption(TControl* AClient) {
  auto* F = dynamic_cast<TCustomForm*>(AClient);
  if (!F || F->Caption().empty()) return "Untitled Window";
  return F->Caption();
}

void TTabDockHostForm::ResetCaption() {
  TTabDockInfo* Info = SelectedInfo();
  SetCaption(Info ? GetClientCaption(Info->FDockClient) : String());
}

void TTabDockHostForm::UpdateStripVisibility() { FDockTab->SetVisible(FDockTab->TabCount() >= 2); }

void TTabDockHostForm::mnuTopClick(TObject* Sender) {
  auto* Item = dynamic_cast<TMenuItem*>(Sender);
  if (!Item) return;
  for (std::size_t I = 0; I < 4; ++I) FMenuItems[I]->SetChecked(FMenuItems[I] == Item);
  SetDockTabPosition(static_cast<TTabPosition>(Item->Tag()));
}

void TTabDockHostForm::TabPosPopupMenuPopup(TPoint AScreenPos) {
  FItemToHide = FDockTab->TabAt(FDockTab->ScreenToClient(AScreenPos));
  FMenuItems[5]->SetEnabled(FItemToHide != -1);
  if (FItemToHide != -1) FDockTab->SetTabIndex(FItemToHide);
  for (std::size_t I = 0; I < 4; ++I) FMenuItems[I]->SetChecked(FDockTab->Align() == StripAligns[I]);
}

void TTabDockHostForm::mnuHideTabClick(TObject*) {
  if (FItemToHide < 0 || FItemToHide >= FDockTab->TabCount()) return;
  if (TTabDockInfo* Info = GetDockClientInfoFromTab(FItemToHide)) Info->FDockClient->Hide();
  FItemToHide = -1;
  if (FDockTab->TabCount() == 0)
    Hide();
  else if (FDockTab->TabCount() == 1)
    FDockTab->Hide();
}

void TTabDockHostForm::ChangeActivePage(TPanel* APanel) {
  if (APanel == FActivePage) return;
  TPanel* Old = FActivePage;
  bool HadFocus = Old && Within(GetFocus(), Old);
  if (APanel) {
    FDockPanel->BringToFront(APanel);
    APanel->Show();
    if (HadFocus) SetFocus(CanTakeFocus(APanel) ? static_cast<TWinControl*>(APanel) : this);
  }
  if (Old) Old->Hide();
  FActivePage = APanel;
}

void TTabDockHostForm::DockTabClick(TObject*) {
  if (FDraggingInfo || (Locked() && !Parent())) return;
  TTabDockInfo* Info = SelectedInfo();
  if (Info)
    Info->SetActive();
  else
    ChangeActivePage(nullptr);
  if (FDownDockInfo != Info) FDownDockInfo = nullptr;
  ResetCaption();
}

void TTabDockHostForm::CMDialogChar(TMessage& Message) {
  Message.Result = SendMessage(FDockPanel, Message.Msg, Message.WParam, Message.LParam);
}

void TTabDockHostForm::UnlockUpdates() {
  inherited::UnlockUpdates();
  if (!FDestroying) DockTabClick(this);
}

void TTabDockHostForm::DockTabMouseDown(TMouseButton Button, TPoint P) {
  FDownDockInfo = nullptr;
  FDownPos = P;
  int Tab = FDockTab->TabAt(P);
  if (Tab == -1) return;
  FDockTab->SetTabIndex(Tab);
  if (Button == mbLeft) FDownDockInfo = GetDockClientInfoFromTab(Tab);
}

void TTabDockHostForm::DockTabMouseMove(TPoint P) {
  if (FTabDrag) {
    FTabDrag->MoveTo(FDockTab->ClientToScreen(P));
    return;
  }
  if (!FDownDockInfo) return;
  if (std::abs(P.X - FDownPos.X) < DragThreshold && std::abs(P.Y - FDownPos.Y) < DragThreshold) return;
  TControl* Client = std::exchange(FDownDockInfo, nullptr)->FDockClient;
  FTabDrag = std::make_unique<TDockDrag>(Client);
  FTabDrag->MoveTo(FDockTab->ClientToScreen(P));
}

void TTabDockHostForm::DockTabMouseUp(TPoint P) {
  FDownDockInfo = nullptr;
  if (!FTabDrag) return;
  // The drop may take the host apart later; the drag goes first.
  std::unique_ptr<TDockDrag> Drag = std::move(FTabDrag);
  Drag->MoveTo(FDockTab->ClientToScreen(P));
  (void)Drag->Drop();
}

void TTabDockHostForm::DoAddDockClient(TControl* AClient) {
  if (auto* Other = dynamic_cast<TTabDockHostForm*>(AClient)) {
    // Its clients move over one by one; the emptied host ends by its own rule.
    Other->Hide();
    while (!Other->FDockInfos.empty()) {
      TControl* Client = Other->FDockInfos.back()->FDockClient;
      ManualDock(Client, this);
      if (auto* D = dynamic_cast<TDockableForm*>(Client)) SetDockSite(D, false);
    }
    return;
  }
  RememberUndockedSize(AClient);
  TTabDockInfo* Info = nullptr;
  if (FDraggingInfo && !FDraggingInfo->FDockClient && AClient->Visible()) {
    // The tab shown during the drag becomes the client's.
    Info = std::exchange(FDraggingInfo, nullptr);
    Info->FDockClient = AClient;
    FDockTab->SetTabText(Info->FTabIndex, GetClientCaption(AClient));
  } else {
    FDockInfos.push_back(TObjectGuard<TTabDockInfo>(new TTabDockInfo(this, AClient)));
    Info = FDockInfos.back().Get();
  }
  Info->CreateTabSheet();
  // Tabs do not nest.
  if (auto* D = dynamic_cast<TDockableForm*>(AClient)) SetDockSite(D, false);
  if (AClient->Visible()) {
    Info->ShowClient();
    Info->SetActive();
  }
  UpdateStripVisibility();
  ResetCaption();
  ResetStayOnTop();
}

void TTabDockHostForm::DoRemoveDockClient(TControl* AClient) {
  ForgetClient(AClient);
  auto* Dockable = dynamic_cast<TDockableForm*>(AClient);
  if (Dockable && !Dockable->AboutToDestroy() && !dynamic_cast<TTabDockHostForm*>(FUndockTarget))
    SetDockSite(Dockable, true);
  if (TTabDockInfo* Info = GetDockClientInfo(AClient)) {
    if (Info->TabSheet() && Info->TabSheet() == FActivePage) ChangeActivePage(nullptr);
    if (FDownDockInfo == Info) FDownDockInfo = nullptr;
    Info->RemoveDockClient();
    std::erase_if(FDockInfos, [Info](const TObjectGuard<TTabDockInfo>& I) { return I.Get() == Info; });
    if (!FDestroying) DockTabClick(this);
  }
  if (FDestroying || Dissolving()) return;
  if (FDockTab->TabCount() > 1) {
    ResetCaption();
    ResetStayOnTop();
    return;
  }
  TControl* Client = Dockable && Dockable->AboutToDestroy() ? nullptr : AClient;
  if (!DontReleaseForm() && FDockInfos.size() < 2) PostFinalUndock(Client);
  if (Client && CanTakeFocus(Client) && (Within(GetFocus(), Client) || Within(GetFocus(), this)))
    SetFocus(static_cast<TWinControl*>(Client));
  FDockTab->Hide();
}

void TTabDockHostForm::GetSiteInfo(TControl* Client, TRect& InfluenceRect, TPoint MousePos, bool& CanDock) {
  inherited::GetSiteInfo(Client, InfluenceRect, MousePos, CanDock);
  if (FDockTab->Visible())
    CanDock = ScreenBoundsOf(FDockTab).Contains(MousePos) && !IsEditWindow(Client);
  else
    CanDock = CanDock && !IsEditWindow(Client);
}

int TTabDockHostForm::DropTabIndex(int X, int Y) const {
  TPoint P = FDockTab->ScreenToClient(ClientToScreen(Point(X, Y)));
  bool Vertical = FDockTab->Align() == alLeft || FDockTab->Align() == alRight;
  int Along = Vertical ? P.Y : P.X;
  int Tab = FDockTab->TabAt(P);
  if (Tab == -1) return Along < 5 ? 0 : FDockTab->TabCount();
  int Dragged = FDraggingInfo ? FDraggingInfo->FTabIndex : -1;
  if (Tab == Dragged) return Tab;
  int Index = Tab;
  if (Dragged != -1 && Dragged < Tab) --Index;
  TRect R = FDockTab->TabRect(Tab);
  if (Along > (Vertical ? (R.Top + R.Bottom) / 2 : (R.Left + R.Right) / 2)) ++Index;
  return Index;
}

void TTabDockHostForm::DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) {
  inherited::DockOver(Source, X, Y, State, Accept);
  if (!FDockTab->Visible() && !FDraggingInfo) return;
  TControl* Dragged = Source->Control();
  Accept = dynamic_cast<TCustomForm*>(Dragged) && !IsEditWindow(Dragged);
  // The drop shows as a tab in the strip, not as a frame.
  Source->SetDockRect(TRect());
  if (State == dsDragLeave) {
    EndStripDrag();
    return;
  }
  if (!Accept) return;
  int Index = DropTabIndex(X, Y);
  if (State == dsDragEnter) {
    FOriginalIndex = FDockTab->TabIndex();
    FDraggingInfo = GetDockClientInfo(Dragged);
    if (!FDraggingInfo || FDraggingInfo->FTabIndex == -1) {
      // Provisional: no client until the drop gives it one.
      FDockInfos.push_back(TObjectGuard<TTabDockInfo>(new TTabDockInfo(this, nullptr)));
      FDraggingInfo = FDockInfos.back().Get();
      FDraggingInfo->FTabIndex = FDockTab->AddTab(GetClientCaption(Dragged), FDraggingInfo);
    }
    FDraggingInfo->BeginDragging();
  }
  FDraggingInfo->SetTabIndex(std::min(Index, FDockTab->TabCount() - 1));
  FDockTab->SetTabIndex(FDraggingInfo->FTabIndex);
}

void TTabDockHostForm::EndStripDrag() {
  if (!FDraggingInfo) return;
  TTabDockInfo* Info = std::exchange(FDraggingInfo, nullptr);
  if (FDownDockInfo == Info) FDownDockInfo = nullptr;
  Info->EndDragging();
  if (!Info->FDockClient) {
    Info->RemoveTab();
    std::erase_if(FDockInfos, [Info](const TObjectGuard<TTabDockInfo>& I) { return I.Get() == Info; });
  }
  if (FOriginalIndex < FDockTab->TabCount()) FDockTab->SetTabIndex(FOriginalIndex);
  DockTabClick(this);
}

void TTabDockHostForm::CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result) {
  if (FDraggingInfo && FDraggingInfo->FDockClient == Source->Control()) {
    FDraggingInfo = nullptr;
    Source->Control()->SetAlign(alClient);
    DockTabClick(this);
    return;
  }
  inherited::CMDockClient(Source, MousePos, Result);
  // A drop that docked nothing leaves no provisional tab behind.
  EndStripDrag();
}

void TTabDockHostForm::CMUnDockClient(TControl* Client, TWinControl* NewTarget) {
  FUndockTarget = NewTarget;
  auto Clear = Finally([this]() noexcept { FUndockTarget = nullptr; });
  inherited::CMUnDockClient(Client, NewTarget);
  Client->SetAlign(alNone);
}

void TTabDockHostForm::CMDockNotification(TControl* Client, TDockNotifyKind Kind) {
  TTabDockInfo* Info = GetDockClientInfo(Client);
  if (Info && Kind == TDockNotifyKind::CaptionChanged && Info->FTabIndex != -1) {
    FDockTab->SetTabText(Info->FTabIndex, GetClientCaption(Client));
    if (Info->FTabIndex == FDockTab->TabIndex()) ResetCaption();
  }
  if (Info && Kind == TDockNotifyKind::VisibleChanged) {
    if (Client->Visible()) {
      if (!TIDEDesktopService::IsLocked()) Show();
      Info->ShowClient();
    } else {
      Info->RemoveTab();
    }
    UpdateStripVisibility();
    if (FDockTab->TabCount() == 0) Hide();
  }
  inherited::CMDockNotification(Client, Kind);
}

bool TTabDockHostForm::DockReplaceDockClient(TControl* AClient, TWinControl* ANewHost, TControl* ANewClient) {
  TTabDockInfo* Info = GetDockClientInfo(AClient);
  if (!Info) return false;
  int Index = Info->FTabIndex;
  if (ANewHost) ManualDock(AClient, ANewHost);
  if (!GetDockClientInfo(ANewClient)) ManualDock(ANewClient, this);
  ANewClient->SetAlign(alClient);
  if (TTabDockInfo* New = GetDockClientInfo(ANewClient); New && Index != -1 && New->FTabIndex != -1)
    New->SetTabIndex(std::min(Index, FDockTab->TabCount() - 1));
  return true;
}

void TTabDockHostForm::SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) {
  if (!ADesktop || FDockInfos.empty()) return;
  inherited::SaveWindowState(ADesktop, AIsProject);
  ADesktop->WriteInteger(DeskSection(), KeyTabPosition, static_cast<int>(FDockTab->TabPosition()));
  if (TTabDockInfo* Info = SelectedInfo())
    if (auto* D = dynamic_cast<TDesktopForm*>(Info->FDockClient))
      ADesktop->WriteString(DeskSection(), KeyActiveTabID, D->DeskSection());
  auto Order = [](const TObjectGuard<TTabDockInfo>& I) { return I->FTabIndex == -1 ? INT_MAX : I->FTabIndex; };
  std::stable_sort(FDockInfos.begin(), FDockInfos.end(),
                   [&](const auto& A, const auto& B) { return Order(A) < Order(B); });
  String Names;
  for (const auto& Info : FDockInfos) {
    auto* D = dynamic_cast<TDesktopForm*>(Info->FDockClient);
    if (!D) continue;
    if (!Names.empty()) Names += ",";
    Names += D->DeskSection();
  }
  ADesktop->WriteString(DeskSection(), KeyTabDockClients, Names);
}

void TTabDockHostForm::LoadWindowState(TCustomIniFile* ADesktop) {
  if (!ADesktop) return;
  inherited::LoadWindowState(ADesktop);
  int Position = ADesktop->ReadInteger(DeskSection(), KeyTabPosition, 1);
  SetDockTabPosition(Position >= tpTop && Position <= tpRight ? static_cast<TTabPosition>(Position) : tpBottom);
  String Text = ADesktop->ReadString(DeskSection(), KeyTabDockClients, String());
  if (Text.empty()) Abort();
  std::vector<String> Names = SplitAtCommas(Text);
  for (const auto& Info : FDockInfos) {
    if (auto* D = dynamic_cast<TDesktopForm*>(Info->FDockClient)) D->LockUpdates();
    Info->RemoveTab();
  }
  std::vector<TDesktopForm*> Found;
  for (const String& Name : Names) {
    int Index = LoadedDesktopFormInstances ? LoadedDesktopFormInstances->IndexOf(Name) : -1;
    auto* F = Index < 0 ? nullptr : dynamic_cast<TDesktopForm*>(LoadedDesktopFormInstances->GetObject(Index));
    if (!F || F == this) continue;
    F->LockUpdates();
    Found.push_back(F);
  }
  for (TDesktopForm* F : Found) {
    if (HostDockSite(F) != this)
      ManualDock(F, this);
    else if (TTabDockInfo* Info = GetDockClientInfo(F); Info && F->Visible())
      Info->CreateTab();
    F->LoadWindowState(ADesktop);
  }
  if (FDockTab->TabCount() == 1) FDockTab->Hide();
  String ActiveID = ADesktop->ReadString(DeskSection(), KeyActiveTabID, String());
  String ActiveCaption = ActiveID.empty() ? ADesktop->ReadString(DeskSection(), KeyActiveTab, String()) : String();
  for (int I = 0; I < FDockTab->TabCount(); ++I) {
    TTabDockInfo* Info = GetDockClientInfoFromTab(I);
    auto* D = Info ? dynamic_cast<TDesktopForm*>(Info->FDockClient) : nullptr;
    bool Match = !ActiveID.empty() ? D && D->DeskSection() == ActiveID
                                   : !ActiveCaption.empty() && CompareText(FDockTab->TabText(I), ActiveCaption) == 0;
    if (Match) {
      FDockTab->SetTabIndex(I);
      break;
    }
  }
}

} // namespace formkit
