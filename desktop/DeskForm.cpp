//===- desktop/DeskForm.cpp - Windows that keep their state in a desktop -===//
#include "desktop/DeskForm.h"

#include "desktop/BaseIDEFrame.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SInvalidHexText, "'%s' is not valid hexadecimal text");

namespace {
bool GForceUpdateBounds = false;

// Keys of a window's section.
constexpr const char* KeyPercentageSizes = "PercentageSizes";
constexpr const char* KeyCreate = "Create";
constexpr const char* KeyVisible = "Visible";
constexpr const char* KeyDocked = "Docked";
constexpr const char* KeyState = "State";

/// The platform's show command of a state, or hide.
std::uint32_t ShowCommandOf(TWindowState State, bool Visible) {
  if (!Visible) return SW_HIDE;
  switch (State) {
  case wsMinimized: return SW_MINIMIZE;
  case wsMaximized: return SW_SHOWMAXIMIZED;
  default: return SW_SHOWNORMAL;
  }
}

/// A placement's rectangle is in screen coordinates for a tool window, in workspace
/// coordinates for any other.
TRect PlacementToScreen(const TRect& R, bool ToolWindow) { return ToolWindow ? R : WorkspaceToScreen(R); }
TRect ScreenToPlacement(const TRect& R, bool ToolWindow) { return ToolWindow ? R : ScreenToWorkspace(R); }

TWindowState StateFromOrdinal(int Value) {
  return Value == 1 ? wsMinimized : (Value == 2 ? wsMaximized : wsNormal);
}
} // namespace

//===----------------------------------------------------------------------===//
// Helpers
//===----------------------------------------------------------------------===//

TCustomForm* GetParentForm(const TControl* Control) noexcept {
  TCustomForm* Found = nullptr;
  for (const TControl* C = Control; C; C = C->Parent())
    if (auto* F = dynamic_cast<const TCustomForm*>(C)) Found = const_cast<TCustomForm*>(F);
  return Found;
}

String BinToHex(const std::vector<std::uint8_t>& Bytes) {
  static constexpr char Digits[] = "0123456789ABCDEF";
  String Out;
  Out.reserve(Bytes.size() * 2);
  for (std::uint8_t B : Bytes) {
    Out += Digits[B >> 4];
    Out += Digits[B & 15];
  }
  return Out;
}

std::vector<std::uint8_t> HexToBin(const String& Text) {
  auto Digit = [&](char C) -> int {
    if (C >= '0' && C <= '9') return C - '0';
    if (C >= 'A' && C <= 'F') return C - 'A' + 10;
    if (C >= 'a' && C <= 'f') return C - 'a' + 10;
    throw EConvertError(SInvalidHexText, Text);
  };
  if (Text.size() % 2 != 0) throw EConvertError(SInvalidHexText, Text);
  std::vector<std::uint8_t> Bytes;
  Bytes.reserve(Text.size() / 2);
  for (std::size_t I = 0; I < Text.size(); I += 2)
    Bytes.push_back(static_cast<std::uint8_t>(Digit(Text[I]) * 16 + Digit(Text[I + 1])));
  return Bytes;
}

//===----------------------------------------------------------------------===//
// Lifetime
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDesktopForm, "DeskForm") {}

bool TDesktopForm::ForceUpdateBounds() noexcept { return GForceUpdateBounds; }
void TDesktopForm::SetForceUpdateBounds(bool Value) noexcept { GForceUpdateBounds = Value; }

void TDesktopForm::Create(TComponent* AOwner) {
  // Before the inherited constructor, so a window made during a load is batched from the first.
  FLocked = TIDEDesktopService::IsLocked();
  inherited::Create(AOwner);
  if (AddMainFormShownEvent) {
    AddMainFormShownEvent(TNotifyEvent::Bind<&TDesktopForm::MainFormShown>(this));
    FSubscribedToMainForm = true;
  }
  if (InitializeForm) InitializeForm(this);
  FAutoSave = true;
  if (FLocked) LockUpdates();
}

void TDesktopForm::BeforeDestruction() {
  if (FSubscribedToMainForm && RemoveMainFormShownEvent)
    RunIgnoringExceptions([this] { RemoveMainFormShownEvent(TNotifyEvent::Bind<&TDesktopForm::MainFormShown>(this)); });
  if (GetFieldAddress && !GetInstanceName(ClassType(), FDeskSection).empty())
    RunIgnoringExceptions([this] {
      TCustomForm** Var = GetFieldAddress(GetInstanceName(ClassType(), FDeskSection));
      if (Var && *Var == this) *Var = nullptr;
    });
  TIDEDesktopService::RemoveLockedForm(this);
  if (LoadedDesktopFormInstances)
    for (int I = LoadedDesktopFormInstances->Count() - 1; I >= 0; --I)
      if (LoadedDesktopFormInstances->GetObject(I) == this) LoadedDesktopFormInstances->Delete(I);
  inherited::BeforeDestruction();
}

void TDesktopForm::MainFormShown(TObject*) { DoMainFormShown(); }

bool TDesktopForm::IsMainForm() const noexcept {
  return Application()->MainForm() == static_cast<const TCustomForm*>(this);
}

String TDesktopForm::SectionOrClass() const { return FDeskSection.empty() ? ClassName() : FDeskSection; }

//===----------------------------------------------------------------------===//
// Edits
//===----------------------------------------------------------------------===//

bool TDesktopForm::EditAction(TEditAction AAction) {
  IEditHandler* H = FindFocusedEditHandler(this);
  return H && H->EditAction(AAction);
}

TEditState TDesktopForm::GetEditState() {
  IEditHandler* H = FindFocusedEditHandler(this);
  return H ? H->GetEditState() : TEditState::FromMask(AllEditStates);
}

//===----------------------------------------------------------------------===//
// Units of the desktop file
//===----------------------------------------------------------------------===//

namespace {
TRect PrimaryWorkArea() { return Screen()->PrimaryMonitor()->WorkareaRect(); }
} // namespace

void TDesktopForm::DesktopPosActualToRelative(int& X, int& Y) const {
  if (Docked()) return;
  TMonitor* M = Screen()->PrimaryMonitor();
  X = TIDEDesktopService::ActualToRelative(X - M->Left(), M->WorkareaRect().Width());
  Y = TIDEDesktopService::ActualToRelative(Y - M->Top(), M->WorkareaRect().Height());
}

void TDesktopForm::DesktopSizeActualToRelative(int& W, int& H) {
  TRect Work = PrimaryWorkArea();
  W = TIDEDesktopService::ActualToRelative(W, Work.Width());
  H = TIDEDesktopService::ActualToRelative(H, Work.Height());
}

void TDesktopForm::DesktopPosRelativeToActual(int& X, int& Y) {
  TRect Work = PrimaryWorkArea();
  X = TIDEDesktopService::RelativeToActual(X, Work.Width()) + Work.Left;
  Y = TIDEDesktopService::RelativeToActual(Y, Work.Height()) + Work.Top;
  TRect Desk = Screen()->DesktopRect();
  X = std::clamp(X, Desk.Left, Desk.Left + Desk.Width());
  Y = std::clamp(Y, Desk.Top, Desk.Top + Desk.Height());
}

void TDesktopForm::DesktopSizeRelativeToActual(int& W, int& H) {
  TRect Work = PrimaryWorkArea();
  if (W > 0) W = TIDEDesktopService::RelativeToActual(W, Work.Width());
  if (H > 0) H = TIDEDesktopService::RelativeToActual(H, Work.Height());
}

TRect TDesktopForm::GetDeskWindowScreenCoordinates(TCustomIniFile* ADesktop, const TDeskRuntimeInfo& AInfo) {
  bool Percent = ADesktop->ReadBool(FDeskSection, KeyPercentageSizes, false);
  int X = AInfo.Left, Y = AInfo.Top, W = AInfo.Width, H = AInfo.Height;
  if (!AInfo.Valid) {
    X = ADesktop->ReadInteger(FDeskSection, "Left", Left());
    Y = ADesktop->ReadInteger(FDeskSection, "Top", Top());
    W = ADesktop->ReadInteger(FDeskSection, "Width", -1);
    H = ADesktop->ReadInteger(FDeskSection, "Height", -1);
  }
  if (Percent) DesktopPosRelativeToActual(X, Y);
  W = TIDEDesktopService::AdjustWidth(W, Width(), Percent);
  H = TIDEDesktopService::AdjustHeight(H, Height(), Percent);
  return Bounds(X, Y, W, H);
}

TWindowState TDesktopForm::GetDeskWindowState(TCustomIniFile* ADesktop, const TDeskRuntimeInfo& AInfo) {
  if (AInfo.Valid) return AInfo.WindowState;
  return StateFromOrdinal(ADesktop->ReadInteger(FDeskSection, KeyState, 0));
}

//===----------------------------------------------------------------------===//
// Saving
//===----------------------------------------------------------------------===//

void TDesktopForm::ZoomWindow() { SetWindowState(WindowState() == wsMaximized ? wsNormal : wsMaximized); }

TDeskRuntimeInfo TDesktopForm::GetDeskRuntimeInfo() { return TDeskRuntimeInfo(); }

TRect TDesktopForm::WorkspaceRestoredRect(const TWindowPlacement& P) const {
  // A tool window's placement is in screen coordinates; the file keeps workspace ones.
  return IsToolWindow() ? ScreenToWorkspace(P.rcNormalPosition) : P.rcNormalPosition;
}

void TDesktopForm::SaveWindowRuntimeInfo(TDeskRuntimeInfo& AInfo) {
  TWindowPlacement P = Placement();
  TRect R = WorkspaceRestoredRect(P);
  int X = R.Left, Y = R.Top, W = R.Width(), H = R.Height();
  DesktopPosActualToRelative(X, Y);
  DesktopSizeActualToRelative(W, H);
  AInfo = {true, X, Y, W, H, WindowState()};
}

void TDesktopForm::SaveWindowState(TCustomIniFile* ADesktop, bool) {
  if (!ADesktop) return;
  const String& S = FDeskSection;
  ADesktop->WriteBool(S, KeyPercentageSizes, true);
  ADesktop->WriteBool(S, KeyCreate, true);
  ADesktop->WriteBool(S, KeyVisible, Visible());
  ADesktop->WriteBool(S, KeyDocked, Docked());
  ADesktop->WriteInteger(S, KeyState, static_cast<int>(WindowState()));
  TWindowPlacement P = Placement();
  TRect R = WorkspaceRestoredRect(P);
  int X = R.Left, Y = R.Top;
  DesktopPosActualToRelative(X, Y);
  ADesktop->WriteInteger(S, "Left", X);
  ADesktop->WriteInteger(S, "Top", Y);
  int W = R.Width(), H = R.Height();
  DesktopSizeActualToRelative(W, H);
  ADesktop->WriteInteger(S, "Width", W);
  ADesktop->WriteInteger(S, "Height", H);
  int MX = P.ptMaxPosition.X, MY = P.ptMaxPosition.Y;
  DesktopPosActualToRelative(MX, MY);
  ADesktop->WriteInteger(S, "MaxLeft", MX);
  ADesktop->WriteInteger(S, "MaxTop", MY);
  if (WindowState() == wsMaximized) {
    ADesktop->WriteInteger(S, "MaxWidth", W);
    ADesktop->WriteInteger(S, "MaxHeight", H);
  }
  int CW = ClientWidth(), CH = ClientHeight();
  DesktopSizeActualToRelative(CW, CH);
  ADesktop->WriteInteger(S, "ClientWidth", CW);
  ADesktop->WriteInteger(S, "ClientHeight", CH);
  if (FAllowAdjustPosForDPI) {
    ADesktop->WriteInteger(S, "PixelsPerInch", CurrentPPI());
    ADesktop->WriteInteger(S, "MonitorNum", Monitor()->MonitorNum());
  }
}

//===----------------------------------------------------------------------===//
// Loading
//===----------------------------------------------------------------------===//

void TDesktopForm::FillPlacement(TWindowState State, bool Visible) {
  FWindowPlacement = TWindowPlacement();
  FWindowPlacement.rcNormalPosition = ScreenToPlacement(FLastLoadedBounds, IsToolWindow());
  FWindowPlacement.showCmd = ShowCommandOf(State, Visible);
}

void TDesktopForm::ScaleLoadedBoundsForDPI(TCustomIniFile* ADesktop) {
  int FilePPI = ADesktop->ReadInteger(FDeskSection, "PixelsPerInch", 0);
  int Current = CurrentPPI();
  if (!FAllowAdjustPosForDPI || FilePPI < DefaultPPI || FilePPI == Current) return;
  TRect& R = FLastLoadedBounds;
  R = Bounds(R.Left, R.Top, MulDiv(R.Width(), Current, FilePPI), MulDiv(R.Height(), Current, FilePPI));
  // The held placement restores to the scaled size too.
  FWindowPlacement.rcNormalPosition = ScreenToPlacement(R, IsToolWindow());
}

void TDesktopForm::LoadWindowState(TCustomIniFile* ADesktop) {
  if (!ADesktop) return;
  if (!FLocked && TIDEDesktopService::IsLocked()) LockUpdates();
  // The main window exists in every desktop.
  bool Main = IsMainForm();
  if (ADesktop->ReadBool(FDeskSection, KeyCreate, false) || Main) LoadPlacement(ADesktop, Main);
  NotifyParentResolution();
}

void TDesktopForm::LoadPlacement(TCustomIniFile* ADesktop, bool AMain) {
  SetPosition(poDesigned);
  bool Show = ADesktop->ReadBool(FDeskSection, KeyVisible, false) || AMain;
  bool IsDocked = ADesktop->ReadBool(FDeskSection, KeyDocked, false);
  if (!IsDocked) {
    if (Docked()) ManualFloat(this, BoundsRect());
    SetAlign(alNone);
  }
  FLastLoadedBounds = GetDeskWindowScreenCoordinates(ADesktop, GetDeskRuntimeInfo());
  AdjustLastLoadedBounds();
  TWindowState State = GetDeskWindowState(ADesktop, GetDeskRuntimeInfo());
  // A maximised window that must change monitors is restored first, so that it can move.
  if (State != WindowState() ||
      (State == wsMaximized && Screen()->MonitorFromPoint(FLastLoadedBounds.TopLeft()) != Monitor()))
    SetWindowState(wsNormal);
  FillPlacement(State, Show);
  if (!IsDocked) {
    if (!Show && Showing()) Hide();
    FWindowPlacementDirty = !Showing();
    if (State != wsMaximized || GForceUpdateBounds) {
      ScaleLoadedBoundsForDPI(ADesktop);
      SetBoundsRect(FLastLoadedBounds);
    }
    if (Showing()) ApplyPlacement();
    if (State == wsNormal) SetWindowState(wsNormal);
  }
  SetVisible(Show);
  FLoadedFromDesktop = true;
}

void TDesktopForm::NotifyParentResolution() {
  if (IsMainForm() || !Parent()) return;
  TCustomForm* ParentForm = GetParentForm(Parent());
  if (!ParentForm) return;
  int Own = CurrentPPI();
  int Theirs = ParentForm->CurrentPPI();
  if (Own == Theirs) return;
  TRect Suggested = Rect(0, 0, MulDiv(Width(), Theirs, Own), MulDiv(Height(), Theirs, Own));
  Perform(WM_DPICHANGED, Theirs, reinterpret_cast<std::intptr_t>(&Suggested));
}

//===----------------------------------------------------------------------===//
// Dock clients
//===----------------------------------------------------------------------===//

namespace {
std::vector<TDesktopForm*> DesktopFormsOf(TWinControl* ASite) {
  std::vector<TDesktopForm*> Forms;
  for (int I = 0; I < ASite->ControlCount(); ++I)
    if (auto* F = dynamic_cast<TDesktopForm*>(ASite->Controls(I))) Forms.push_back(F);
  return Forms;
}
} // namespace

void TDesktopForm::SaveDockClients(TCustomIniFile* ADesktop, bool, const String& AKey, TWinControl* ASite) {
  String Names;
  for (TControl* C : DockClients(ASite)) {
    auto* F = dynamic_cast<TDesktopForm*>(C);
    if (!F) continue;
    if (!Names.empty()) Names += ",";
    Names += F->DeskSection();
  }
  if (!Names.empty()) ADesktop->WriteString(FDeskSection, AKey, Names);
}

void TDesktopForm::SaveDockStream(TCustomIniFile* ADesktop, const String& AKey, TWinControl* ASite) {
  IPtr<IDockManager> Manager = DockManager(ASite);
  if (!IsDockSite(ASite) || !Manager || DockClients(ASite).empty()) return;
  TObjectGuard<TMemoryStream> Stream(new TMemoryStream);
  Manager->SaveToStream(Stream.Get());
  std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(Stream->Size()));
  Stream->SetPosition(0);
  if (!Bytes.empty()) Stream->ReadBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  ADesktop->WriteString(FDeskSection, AKey, BinToHex(Bytes));
}

bool TDesktopForm::LoadDockClients(TCustomIniFile* ADesktop, const String& AKey, TWinControl* ASite) {
  for (TDesktopForm* F : DesktopFormsOf(ASite)) F->FDockingTouched = false;
  String Names = ADesktop->ReadString(FDeskSection, AKey, String());
  if (Names.empty()) return false;
  std::size_t Pos = 0;
  while (Pos <= Names.size()) {
    std::size_t Comma = std::min(Names.find(',', Pos), Names.size());
    String Name = Names.substr(Pos, Comma - Pos);
    Pos = Comma + 1;
    int Index = LoadedDesktopFormInstances ? LoadedDesktopFormInstances->IndexOf(Name) : -1;
    auto* F = Index < 0 ? nullptr : dynamic_cast<TDesktopForm*>(LoadedDesktopFormInstances->GetObject(Index));
    if (!F) continue;
    F->LockUpdates();
    F->SetWindowState(wsNormal);
    if (HostDockSite(F) != ASite) ManualDock(F, ASite);
    F->FDockingTouched = true;
  }
  std::vector<TDesktopForm*> Present = DesktopFormsOf(ASite);
  for (auto It = Present.rbegin(); It != Present.rend(); ++It)
    if (!(*It)->FDockingTouched) {
      (*It)->LockUpdates();
      ManualFloat(*It, (*It)->BoundsRect());
    }
  return true;
}

void TDesktopForm::LoadDockClient(TDesktopForm* Client, TCustomIniFile* ADesktop) {
  auto Untouch = Finally([Client]() noexcept { Client->FDockingTouched = false; });
  try {
    Client->PrepareLoadAsDockClient();
    Client->LoadWindowState(ADesktop);
  } catch (const EAbort&) {
    // A host with nothing to hold is simply not restored.
  } catch (const Exception& E) {
    Exception Report(SLoadingDesktopFailed, ADesktop->FileName(), Client->Name(), E.ClassName(), String(E.what()));
    Application()->ShowException(Report);
  }
}

void TDesktopForm::LoadDockStream(TCustomIniFile* ADesktop, const String& AKey, TWinControl* ASite) {
  String Text = ADesktop->ReadString(FDeskSection, AKey, String());
  if (Text.empty()) return;
  for (TDesktopForm* F : DesktopFormsOf(ASite))
    if (F->FDockingTouched) LoadDockClient(F, ADesktop);
  std::vector<std::uint8_t> Bytes = HexToBin(Text);
  IPtr<IDockManager> Manager = DockManager(ASite);
  if (!Manager) return;
  TObjectGuard<TMemoryStream> Stream(new TMemoryStream);
  if (!Bytes.empty()) Stream->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  Stream->SetPosition(0);
  Manager->LoadFromStream(Stream.Get());
}

//===----------------------------------------------------------------------===//
// Batch and drawing
//===----------------------------------------------------------------------===//

void TDesktopForm::LockUpdates() {
  FLocked = true;
  TIDEDesktopService::AddLockedForm(this);
  LockDrawing();
}

namespace {
/// The first monitor, in order, that holds the top-left or the top-right corner of `R`.
TMonitor* MonitorHoldingTopCorner(const TRect& R) {
  TScreen* Scr = Screen();
  for (int I = 0; I < Scr->MonitorCount(); ++I) {
    TRect Full = Scr->Monitors(I)->BoundsRect();
    if (Full.Contains(R.TopLeft()) || Full.Contains({R.Right - 1, R.Top})) return Scr->Monitors(I);
  }
  return nullptr;
}
} // namespace

void TDesktopForm::KeepPlacementOnAMonitor() {
  if (Docked()) return;
  TRect& R = FWindowPlacement.rcNormalPosition;
  bool Tool = IsToolWindow();
  TRect OnScreen = PlacementToScreen(R, Tool);
  TMonitor* Holder = MonitorHoldingTopCorner(OnScreen);
  if (!Holder) OnScreen = PlacementToScreen(Bounds(0, 0, R.Width(), R.Height()), Tool);
  TMonitor* Target = Holder ? Monitor() : Screen()->Monitors(0);
  if (FWindowPlacement.showCmd != SW_SHOWMAXIMIZED) {
    TRect Full = Target->BoundsRect();
    OnScreen.Right = std::min(OnScreen.Right, Full.Right);
    OnScreen.Bottom = std::min(OnScreen.Bottom, Full.Bottom);
  }
  R = ScreenToPlacement(OnScreen, Tool);
}

void TDesktopForm::ApplyPlacement() {
  KeepPlacementOnAMonitor();
  SetPlacement(FWindowPlacement);
}

void TDesktopForm::ApplyDirtyPlacement() {
  FWindowPlacementDirty = false;
  if (!Visible()) FWindowPlacement.showCmd = SW_HIDE;
  ApplyPlacement();
}

void TDesktopForm::UnlockUpdates() {
  FLocked = false;
  if (FWindowPlacementDirty) ApplyDirtyPlacement();
  if (Docked() && Parent()) Parent()->Realign();
  UnlockDrawing();
}

void TDesktopForm::LockDrawing() {
  if (!CanLockDrawing()) return;
  if (FDrawingLockCount == 0)
    for (int I = 0; I < ControlCount(); ++I) {
      auto* W = dynamic_cast<TWinControl*>(Controls(I));
      auto* F = dynamic_cast<TCustomForm*>(W);
      if (W && W->Visible() && !(F && F->IsToolWindow())) SetRedraw(W, false);
    }
  ++FDrawingLockCount;
}

void TDesktopForm::UnlockDrawing() {
  if (FDrawingLockCount == 0) return;
  if (--FDrawingLockCount > 0 || FUnlockMessagePosted) return;
  PostMessage(this, IDEMUnlockDrawing, 0, 0);
  FUnlockMessagePosted = true;
}

void TDesktopForm::WndProc(TMessage& Message) {
  switch (Message.Msg) {
  case IDEMUnlockDrawing:
    FDrawingLockCount = 0;
    FUnlockMessagePosted = false;
    for (int I = 0; I < ControlCount(); ++I) {
      auto* W = dynamic_cast<TWinControl*>(Controls(I));
      if (!W || !W->Visible()) continue;
      SetRedraw(W, true);
      RedrawWindow(W);
    }
    return;
  case WM_DPICHANGED: {
    const auto* Suggested = reinterpret_cast<const TRect*>(Message.LParam);
    ScaleForPPI(static_cast<int>(Message.WParam));
    if (Suggested) SetBounds(Left(), Top(), Suggested->Width(), Suggested->Height());
    return;
  }
  default: break;
  }
  inherited::WndProc(Message);
  // A window that shows outside a batch takes the placement its load held back.
  if (Message.Msg == CM_VISIBLECHANGED && Message.WParam && !FLocked && FWindowPlacementDirty)
    ApplyDirtyPlacement();
}

} // namespace formkit
