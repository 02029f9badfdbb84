//===- desktop/DockForm.cpp - Tool windows that dock into one another ----===//
#include "desktop/DockForm.h"

#include "desktop/IDEDockPanel.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnWindows.h"

#include <array>

namespace formkit {

int OperatingSystemMajorVersion = 10;
TColor ThemeWindowColor = 0x00FFFFFF;

namespace {
std::array<TClass, 2>& HostClasses() {
  static std::array<TClass, 2> Classes{};
  return Classes;
}

constexpr const char* KeyDockable = "Dockable";

/// Whether a window captioned "SplashScreen" shows.
bool SplashScreenVisible() {
  for (int I = 0; I < Screen()->FormCount(); ++I)
    if (TCustomForm* F = Screen()->Forms(I); F->Visible() && CompareText(F->Caption(), "SplashScreen") == 0) return true;
  return false;
}

/// A colour of the theme counts as bright above the middle of the grey scale.
bool IsBright(TColor C) noexcept {
  if (C & clSystemColor) return C == clWindow;
  int R = C & 0xFF, G = (C >> 8) & 0xFF, B = (C >> 16) & 0xFF;
  return R * 299 + G * 587 + B * 114 >= 128 * 1000;
}
} // namespace

void RegisterDockHostClass(TIDEDockType AType, TClass AClass) { HostClasses()[AType] = AClass; }

TClass DockHostClass(TIDEDockType AType) noexcept { return HostClasses()[AType]; }

TDockHostLink* DockHostLinkOf(TControl* Control) noexcept { return dynamic_cast<TDockHostLink*>(Control); }

void PumpDockingMessages() {
  TMessageTarget* Target = nullptr;
  TMessage M;
  while (PeekMessage(Target, M, UMFinalUndock, UMFinalUndock, true) ||
         PeekMessage(Target, M, CMDeferredDockUpdate, CMDeferredDockUpdate, true)) {
    if (M.Msg == WM_QUIT) {
      PostMessage(Target, M.Msg, M.WParam, M.LParam);
      return;
    }
    SendMessage(Target, M.Msg, M.WParam, M.LParam);
  }
}

//===----------------------------------------------------------------------===//
// TDockableForm
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDockableForm, "DockForm") {}

TAction* TDockableForm::AddAction(const char* Name, const char* Caption, bool Visible) {
  auto* A = CreateComponentOf<TAction>(this);
  A->SetName(Name);
  A->SetCaption(Caption);
  A->SetVisible(Visible);
  A->SetActionList(FDockActionList);
  return A;
}

void TDockableForm::Create(TComponent* AOwner) {
  FSupportsIDETitlebar = OperatingSystemMajorVersion >= 10;
  FDockable = true;
  inherited::Create(AOwner);
  FDockActionList = CreateComponentOf<TActionList>(this);
  FDockActionList->SetName("DockActionList");
  FDockableCmd = AddAction("DockableCmd", "&Dockable", true);
  FDockableCmd->SetChecked(true);
  FDockableCmd->OnExecute = TNotifyEvent::Bind<&TDockableForm::DockableCmdExecute>(this);
  FStayOnTopCmd = AddAction("StayOnTopCmd", "&Stay on Top", true);
  FStayOnTopCmd->OnExecute = TNotifyEvent::Bind<&TDockableForm::StayOnTopCmdExecute>(this);
  FStayOnTopCmd->OnUpdate = TNotifyEvent::Bind<&TDockableForm::StayOnTopCmdUpdate>(this);
  FZoomWindowCmd = AddAction("ZoomWindowCmd", "Zoom Window", false);
  FZoomWindowCmd->OnExecute = TNotifyEvent::Bind<&TDockableForm::ZoomWindowCmdExecute>(this);
  FCloseUndockedWindowCmd = AddAction("CloseUndockedWindowCmd", "Close", false);
  FCloseUndockedWindowCmd->OnExecute = TNotifyEvent::Bind<&TDockableForm::CloseUndockedWindowCmdExecute>(this);
  FLocalMenuCmd = AddAction("LocalMenuCmd", "Local Menu", false);
  FLocalMenuCmd->OnExecute = TNotifyEvent::Bind<&TDockableForm::LocalMenuCmdExecute>(this);
  SetDockSite(this, true);
  SetDragKind(dkDock);
  SetDragMode(dmAutomatic);
  if (evDesktopLoaded) {
    evDesktopLoaded->Add(TNotifyEvent::Bind<&TDockableForm::DesktopLoaded>(this));
    FSubscribed = true;
  }
  if (!DeskSection().empty() && IDEIniFile)
    if (TCustomIniFile* Ini = IDEIniFile()) SetDockable(Ini->ReadBool(DeskSection(), KeyDockable, true));
}

void TDockableForm::BeforeDestruction() {
  if (FSubscribed && evDesktopLoaded)
    RunIgnoringExceptions([this] { evDesktopLoaded->Remove(TNotifyEvent::Bind<&TDockableForm::DesktopLoaded>(this)); });
  FAboutToDestroy = true;
  inherited::BeforeDestruction();
}

TRect TDockableForm::GetTabDockRect() const {
  TRect R = ClientRect();
  int DX = ClientWidth() / 7, DY = ClientHeight() / 5;
  TPoint P = ClientToScreen(Point(R.Left + DX, R.Top + DY));
  return Bounds(P.X, P.Y, R.Width() - 2 * DX, R.Height() - 2 * DY);
}

void TDockableForm::SetDockable(bool AValue) {
  if (AValue == FDockable) return;
  FDockable = AValue;
  FDockableCmd->SetChecked(AValue);
  if (AValue) {
    SetDockSite(this, true);
    SetDragMode(dmAutomatic);
    SetDragKind(dkDock);
    return;
  }
  if (Docked()) ManualFloat(this, ScreenBoundsOf(this));
  SetDockSite(this, false);
  SetDragMode(dmManual);
  SetDragKind(dkDrag);
}

bool TDockableForm::ToggleDockable() {
  SetDockable(!FDockable);
  return FDockable;
}

void TDockableForm::DockableCmdExecute(TObject*) { ToggleDockable(); }

void TDockableForm::SetStayOnTop(bool AValue) {
  FStayOnTopCmd->SetChecked(AValue);
  FFormStyle = AValue ? fsStayOnTop : fsNormal;
  if (TDockHostLink* Host = DockHostLinkOf(HostDockSite(this))) Host->ResetStayOnTop();
}

void TDockableForm::StayOnTopCmdExecute(TObject*) { SetStayOnTop(!FStayOnTopCmd->Checked()); }

void TDockableForm::StayOnTopCmdUpdate(TObject*) { FStayOnTopCmd->SetChecked(FFormStyle == fsStayOnTop); }

void TDockableForm::ZoomWindowCmdExecute(TObject*) {
  if (!Docked()) {
    ZoomWindow();
    return;
  }
  TCustomForm* F = GetParentForm(this);
  if (!F) return;
  F->SetWindowState(F->WindowState() == wsMaximized ? wsNormal : wsMaximized);
}

void TDockableForm::CloseUndockedWindowCmdExecute(TObject*) {
  if (!Docked()) Close();
}

void TDockableForm::SetPopupMenu(TPopupMenu* Value) {
  if (Value) FreeNotification(Value);
  FPopupMenu = Value;
}

void TDockableForm::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FPopupMenu) FPopupMenu = nullptr;
}

void TDockableForm::LocalMenuCmdExecute(TObject*) {
  if (!FPopupMenu) return;
  TPoint P = ClientToScreen(Point(ClientWidth() / 3, ClientHeight() / 3));
  FPopupMenu->Popup(P.X, P.Y);
}

void TDockableForm::ForceShow() {
  for (TControl* C = this; C; C = C->Parent()) C->Show();
}

void TDockableForm::DesktopLoaded(TObject*) {
  if (Visible() && !Parent()) TryIDETitleBar();
}

void TDockableForm::TryIDETitleBar() {
  if (!FSupportsIDETitlebar || Parent()) return;
  // Any bar there is replaced by one built for the form as it is now.
  FHasTitleBar = true;
}

void TDockableForm::TryRemoveTitleBar(bool APost) {
  if (!FHasTitleBar) return;
  if (APost) {
    PostMessage(this, CMRemoveTitleBar, 0, 0);
    return;
  }
  FHasTitleBar = false;
  if (Parent()) Parent()->Realign();
}

void TDockableForm::WndProc(TMessage& Message) {
  switch (Message.Msg) {
  case CMRemoveTitleBar: TryRemoveTitleBar(false); return;
  case CM_PARENTCHANGED:
    inherited::WndProc(Message);
    // While the splash shows, windows are still being placed: no resolution yet.
    if (Visible() && !SplashScreenVisible()) Perform(CMManualDPIChanged);
    if (Parent()) TryRemoveTitleBar(false);
    return;
  case CM_VISIBLECHANGED:
    inherited::WndProc(Message);
    if (Message.WParam != 0) {
      if (Parent())
        TryRemoveTitleBar(true);
      else
        TryIDETitleBar();
    }
    return;
  default: inherited::WndProc(Message);
  }
}

//===----------------------------------------------------------------------===//
// Docking
//===----------------------------------------------------------------------===//

void TDockableForm::GetSiteInfo(TControl* Client, TRect&, TPoint MousePos, bool& CanDock) {
  TWinControl* Host = HostDockSite(this);
  if (Host && HostDockSite(Client) == Host) {
    CanDock = false;
    return;
  }
  TDockHostLink* Link = DockHostLinkOf(Client);
  CanDock = dynamic_cast<TDockableForm*>(Client) && !(Link && Link->HostDockType() == dtJoin);
  if (CanDock && Host) CanDock = GetTabDockRect().Contains(MousePos);
}

void TDockableForm::DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) {
  if (DockManager(this)) {
    TDockHandler::DockOver(Source, X, Y, State, Accept);
    return;
  }
  TPoint P = ClientToScreen(Point(X, Y));
  TRect Tab = GetTabDockRect();
  if (Tab.Contains(P)) {
    Source->SetDockRect(Tab);
    FIDEDockType = dtTab;
  } else {
    FIDEDockType = dtJoin;
    FDockEdge = Source->GetDockEdge(Source->DragPos());
    TRect R = EdgeHalf(ScreenBoundsOf(this), FDockEdge);
    if (!(R == Source->DockRect())) Source->SetDockRect(R);
  }
  DoDockOver(Source, X, Y, State, Accept);
}

void TDockableForm::CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result) {
  CreateDockParent(Source, Result);
  TDockHandler::CMDockClient(Source, MousePos, Result);
}

bool TDockableForm::CreateDockParent(TDragDockObject* Source, std::intptr_t& Result) {
  TClass HostClass = DockHostClass(FIDEDockType);
  if (!HostClass) return false;
  auto* Host = dynamic_cast<TDesktopForm*>(CreateComponent(HostClass, Application()));
  TDockHostLink* Link = DockHostLinkOf(Host);
  if (!Link) {
    if (Host) Host->Destroy();
    return false;
  }
  TWinControl* Site = HostDockSite(this);
  auto* Panel = dynamic_cast<TEditorDockPanel*>(Site);
  if (!Site) Host->SetBoundsRect(BoundsRect());
  if (Panel) Panel->SetResizeSuspended(true);
  {
    auto Settle = Finally([&]() noexcept {
      RunIgnoringExceptions([&] { Host->Show(); });
      if (Panel) RunIgnoringExceptions([&] { Panel->SetResizeSuspended(false); });
    });
    if (Site) ReplaceDockedControl(this, Host);
    Host->Show();
    Link->ManualDockClient(this, nullptr, FDockEdge, FIDEDockType == dtTab);
    Link->ManualDockClient(Source->Control(), nullptr, FDockEdge, false);
  }
  FocusWindow(Host);
  Result = 1;
  return true;
}

void TDockableForm::DoStartDock(TDragDockObject*& DragObject) {
  FParentDrag = Parent();
  TDockHandler::DoStartDock(DragObject);
  if (!DragObject) DragObject = new TIDEDragDockObject(this);
}

void TDockableForm::DoEndDock(TObject* Target, int X, int Y) {
  TDockHandler::DoEndDock(Target, X, Y);
  if (TMonitor* M = Monitor(); M && !Parent() && M->PixelsPerInch() != CurrentPPI()) {
    SetRedraw(this, false);
    auto Thaw = Finally([this]() noexcept { SetRedraw(this, true); });
    ScaleForPPI(M->PixelsPerInch());
  }
  if (Visible()) Perform(CMManualDPIChanged);
  if (FSupportsIDETitlebar && Parent() != FParentDrag) {
    if (Parent())
      TryRemoveTitleBar(true);
    else
      TryIDETitleBar();
  }
}

//===----------------------------------------------------------------------===//
// TIDEDragDockObject
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBlendForm, "DockForm") {}
FK_IMPLEMENT(TIDEDragDockObject, "DockForm") {}

TIDEDragDockObject::TIDEDragDockObject(TControl* AControl) : TDragDockObject(AControl) {
  FBlendForm.Reset(CreateComponentOf<TBlendForm>(nullptr));
  FBlendForm->Hide();
  FBlendForm->SetPosition(poDesigned);
  FBlendForm->SetBorderStyle(bsNone);
  FBlendForm->SetAlphaBlendValue(IsBright(ThemeWindowColor) ? 220 : 200);
  FBlendForm->SetColor(ThemeWindowColor);
  if (dynamic_cast<TWinControl*>(AControl)) FBlendForm->ScaleForPPI(AControl->CurrentPPI());
  auto* Dockable = dynamic_cast<TDockableForm*>(AControl);
  if (Dockable) FBlendForm->SetFont(Dockable->Font());
  FLabel = CreateComponentOf<TLabel>(FBlendForm.Get());
  FLabel->SetParent(FBlendForm.Get());
  FLabel->SetBounds(FBlendForm->ScaleValue(8), FBlendForm->ScaleValue(8), FLabel->Width(), FLabel->Height());
  FLabel->Font()->SetStyle(TFontStyles{fsBold});
  FLabel->Font()->SetColor(clWindowText);
  FLabel->SetCaption(Dockable ? Dockable->Caption() : "Windows");
}

void TIDEDragDockObject::DrawDragDockImage() {
  TDragDockObject::DrawDragDockImage();
  TRect R = DockRect();
  int Mine = Control()->CurrentPPI(), Preview = FBlendForm->CurrentPPI();
  if (Mine != Preview) R = Bounds(R.Left, R.Top, MulDiv(R.Width(), Preview, Mine), MulDiv(R.Height(), Preview, Mine));
  if (!FBlendForm->Visible()) {
    FBlendForm->SetBoundsRect(R);
    FBlendForm->Show();
  } else {
    FBlendForm->Show();
    FBlendForm->SetBoundsRect(R);
  }
}

void TIDEDragDockObject::EraseDragDockImage() {
  TDragDockObject::EraseDragDockImage();
  FBlendForm->Hide();
}

} // namespace formkit
