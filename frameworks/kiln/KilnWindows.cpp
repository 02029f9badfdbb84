//===- frameworks/kiln/KilnWindows.cpp - Placement, focus, redraw, app ---===//
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnWindowTable.h"

namespace formkit {

FK_RESOURCESTRING(SInvalidPlacementLength, "A window placement must declare a length of 44, not %d");
FK_RESOURCESTRING(SInvalidShowCommand, "Unknown show command %d");

//===----------------------------------------------------------------------===//
// Workspace coordinates
//===----------------------------------------------------------------------===//

namespace {
/// How far the work area of the monitor nearest `P` starts right of and below its corner,
/// when it does.
TPoint WorkspaceOffset(TPoint P) {
  TMonitor* M = Screen()->MonitorFromPoint(P, mdNearest);
  int X = M->WorkareaRect().Left - M->Left();
  int Y = M->WorkareaRect().Top - M->Top();
  if (X > 0 || Y > 0) return {X, Y};
  return {0, 0};
}
} // namespace

TRect ScreenToWorkspace(const TRect& R) {
  TPoint Off = WorkspaceOffset(R.TopLeft());
  TRect Out = R;
  Out.Offset(-Off.X, -Off.Y);
  return Out;
}

TRect WorkspaceToScreen(const TRect& R) {
  TPoint Off = WorkspaceOffset(R.TopLeft());
  TRect Out = R;
  Out.Offset(Off.X, Off.Y);
  return Out;
}

//===----------------------------------------------------------------------===//
// Window state and placement
//===----------------------------------------------------------------------===//

TRect TCustomForm::RestoredBounds() const noexcept {
  return FWindowState == wsNormal ? BoundsRect() : FRestoredBounds;
}

void TCustomForm::SetWindowState(TWindowState Value) {
  if (Value == FWindowState) return;
  TRect Restored = RestoredBounds();
  if (Value == wsNormal) {
    FWindowState = wsNormal;
    SetBoundsRect(Restored);
    return;
  }
  FRestoredBounds = Restored;
  FWindowState = Value;
  // A minimised window keeps its bounds: nothing shows it here.
  if (Value == wsMaximized) SetBoundsRect(Screen()->MonitorFromRect(Restored)->WorkareaRect());
}

bool TCustomForm::IsToolWindow() const noexcept {
  return FBorderStyle == bsToolWindow || FBorderStyle == bsSizeToolWin;
}

TWindowPlacement TCustomForm::Placement() const {
  TWindowPlacement P;
  P.ptMinPosition = FMinPosition;
  P.ptMaxPosition = FMaxPosition;
  TRect R = RestoredBounds();
  P.rcNormalPosition = IsToolWindow() ? R : ScreenToWorkspace(R);
  if (!Visible()) P.showCmd = SW_HIDE;
  else if (FWindowState == wsMaximized) P.showCmd = SW_SHOWMAXIMIZED;
  else if (FWindowState == wsMinimized) P.showCmd = SW_SHOWMINIMIZED;
  else P.showCmd = SW_SHOWNORMAL;
  return P;
}

namespace {
bool KnownShowCommand(std::uint32_t Cmd) {
  switch (Cmd) {
  case SW_HIDE: case SW_SHOWNORMAL: case SW_SHOWMINIMIZED: case SW_SHOWMAXIMIZED:
  case SW_SHOWNOACTIVATE: case SW_MINIMIZE: case SW_SHOWMINNOACTIVE: case SW_RESTORE:
    return true;
  default:
    return false;
  }
}

TWindowState StateOfShowCommand(std::uint32_t Cmd, TWindowState Current) {
  switch (Cmd) {
  case SW_HIDE: return Current;
  case SW_SHOWMAXIMIZED: return wsMaximized;
  case SW_SHOWMINIMIZED: case SW_MINIMIZE: case SW_SHOWMINNOACTIVE: return wsMinimized;
  default: return wsNormal;
  }
}
} // namespace

void TCustomForm::SetPlacement(const TWindowPlacement& Value) {
  if (Value.length != WindowPlacementLength)
    throw EInvalidOperation(SInvalidPlacementLength, static_cast<int>(Value.length));
  if (!KnownShowCommand(Value.showCmd)) throw EInvalidOperation(SInvalidShowCommand, static_cast<int>(Value.showCmd));
  TRect R = IsToolWindow() ? Value.rcNormalPosition : WorkspaceToScreen(Value.rcNormalPosition);
  TWindowState State = StateOfShowCommand(Value.showCmd, FWindowState);
  FMinPosition = Value.ptMinPosition;
  FMaxPosition = Value.ptMaxPosition;
  // From normal, with the new restored rectangle, into the state the command asks for.
  FWindowState = wsNormal;
  SetBoundsRect(R);
  SetWindowState(State);
  if (Value.showCmd == SW_HIDE) Hide();
  else Show();
}

void TCustomForm::Activate() {
  if (!Visible()) return;
  TCustomForm* Previous = Screen()->ActiveForm();
  Screen()->FormVisibilityChanged(this, true);
  if (Previous == this) return;
  if (Previous) Previous->Perform(WM_ACTIVATE, 0, 0);
  Perform(WM_ACTIVATE, 1, 0);
}

//===----------------------------------------------------------------------===//
// Showing and redrawing
//===----------------------------------------------------------------------===//

namespace {
void InvalidateTree(TWinControl* Control) {
  ++detail::WindowExtrasOf(Control).Invalidations;
  for (int I = 0; I < Control->ControlCount(); ++I)
    if (auto* W = dynamic_cast<TWinControl*>(Control->Controls(I))) InvalidateTree(W);
}
} // namespace

void SetRedraw(TWinControl* Control, bool Enabled) { detail::WindowExtrasOf(Control).RedrawOff = !Enabled; }

bool RedrawEnabled(const TWinControl* Control) noexcept {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Control);
  return !S || !S->RedrawOff;
}

void ShowWindow(TWinControl* Control, std::uint32_t Cmd) {
  if (!KnownShowCommand(Cmd)) throw EInvalidOperation(SInvalidShowCommand, static_cast<int>(Cmd));
  detail::WindowExtrasOf(Control).WindowHidden = Cmd == SW_HIDE;
  if (auto* Form = dynamic_cast<TCustomForm*>(Control); Form && Cmd != SW_HIDE)
    Form->SetWindowState(StateOfShowCommand(Cmd, Form->WindowState()));
}

bool IsWindowVisible(const TWinControl* Control) noexcept {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Control);
  return Control->Visible() && !(S && S->WindowHidden);
}

void RedrawWindow(TWinControl* Control) { InvalidateTree(Control); }

int InvalidationCount(const TWinControl* Control) noexcept {
  const detail::TWindowExtras* S = detail::FindWindowExtras(Control);
  return S ? S->Invalidations : 0;
}

//===----------------------------------------------------------------------===//
// Focus
//===----------------------------------------------------------------------===//

std::function<void(TCustomForm* Form)> FocusHook;

void SetFocus(TWinControl* Control) {
  detail::SetFocusedControl(Control);
  if (!Control) return;
  TControl* Top = Control;
  while (Top->Parent()) Top = Top->Parent();
  auto* Form = dynamic_cast<TCustomForm*>(Top);
  if (!Form) return;
  Form->Activate();
  if (FocusHook) FocusHook(Form);
}

TWinControl* GetFocus() noexcept { return detail::FocusedControl(); }

//===----------------------------------------------------------------------===//
// TApplication
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TApplication, "KilnForms") {}

void TApplication::SetMainForm(TCustomForm* Value) {
  if (FMainForm == Value) return;
  if (FMainForm) RemoveFreeNotification(FMainForm);
  FMainForm = Value;
  if (Value) FreeNotification(Value);
}

void TApplication::ShowException(const std::exception& E) { FShownExceptions.emplace_back(E.what()); }
void TApplication::HelpContext(int Context) { FHelpRequests.push_back("context " + IntToStr(Context)); }
void TApplication::HelpKeyword(const String& Keyword) { FHelpRequests.push_back("keyword " + Keyword); }

void TApplication::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FMainForm) FMainForm = nullptr;
}

namespace {
TApplication*& ApplicationInstance() {
  static TApplication* A = nullptr;
  return A;
}
} // namespace

TApplication* Application() {
  TApplication*& A = ApplicationInstance();
  if (!A) A = CreateComponentOf<TApplication>(nullptr);
  return A;
}

namespace detail {
void FreeApplication() noexcept {
  FreeAndNil(ApplicationInstance());
  FreeWindowTable();
}
} // namespace detail

} // namespace formkit
