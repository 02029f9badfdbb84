//===- frameworks/kiln/KilnForms.cpp - Forms, frames, data modules, screen ===//
#include "frameworks/kiln/KilnForms.h"

#include "platform/Filer.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SFormIndexError, "Form index out of bounds (%d)");
FK_RESOURCESTRING(SMonitorIndexError, "Monitor index out of bounds (%d)");
FK_RESOURCESTRING(SNoMonitors, "A screen needs at least one monitor");
FK_RESOURCESTRING(SInvalidMonitor,
                  "Monitor %d is not valid: its bounds must not be empty, its work area must lie "
                  "inside them and its pixels per inch must be at least 1");

namespace {
/// Components a root writes at its own level: those that have no parent to stand under.
bool IsRootLevel(TComponent* C) { return !C->HasParent() || !C->GetParentComponent(); }

std::vector<TComponent*> RootLevelComponents(TComponent* Root) {
  std::vector<TComponent*> L;
  for (int I = 0; I < Root->ComponentCount(); ++I)
    if (IsRootLevel(Root->Components(I))) L.push_back(Root->Components(I));
  return L;
}

/// Moves `Child` to rank `Order` among the root-level components, in creation order.
void SetRootLevelOrder(TComponent* Root, TComponent* Child, int Order) {
  std::vector<TComponent*> L = RootLevelComponents(Root);
  if (std::find(L.begin(), L.end(), Child) == L.end()) return;
  Order = std::clamp(Order, 0, static_cast<int>(L.size()) - 1);
  Child->SetComponentIndex(L[static_cast<std::size_t>(Order)]->ComponentIndex());
}

/// The number of children a windowed root yields before its root-level components.
int OwnedControlCount(TWinControl* W, TComponent* Root) {
  int N = 0;
  for (int I = 0; I < W->ControlCount(); ++I)
    if (W->Controls(I)->Owner() == Root) ++N;
  return N;
}
} // namespace

//===----------------------------------------------------------------------===//
// TCustomForm
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCustomForm, "KilnForms") {
  B.Property("BorderStyle", &TCustomForm::BorderStyle, &TCustomForm::SetBorderStyle).Default(bsSizeable);
  detail::PublishCaption(B);
  B.Property("ClientHeight", &TCustomForm::ClientHeight, &TCustomForm::SetClientHeight);
  B.Property("ClientWidth", &TCustomForm::ClientWidth, &TCustomForm::SetClientWidth);
  detail::PublishColor(B, clBtnFace);
  detail::PublishEnabled(B);
  B.Property("Font", &TControl::Font, &TControl::SetFont);
  B.Property("PixelsPerInch", &TCustomForm::PixelsPerInch, &TCustomForm::SetPixelsPerInch);
  B.Property("Scaled", &TCustomForm::Scaled, &TCustomForm::SetScaled).Default(true);
  detail::PublishVisible(B, false);
  detail::PublishOnClick(B);
  B.Event("OnClose", &TCustomForm::OnClose);
  B.Event("OnHide", &TCustomForm::OnHide);
  B.Event("OnShow", &TCustomForm::OnShow);
}

void TCustomForm::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csAcceptsControls, csSetCaption, csOpaque, csClickEvents, csDoubleClicks});
  SetParentFont(false);
  SetVisible(false);
  SetBounds(0, 0, 320, 240);
  Screen()->AddForm(this);
}

void TCustomForm::BeforeDestruction() {
  Screen()->RemoveForm(this);
  inherited::BeforeDestruction();
}

void TCustomForm::SetActiveControl(TWinControl* Value) {
  if (Value == FActiveControl) return;
  if (FActiveControl) RemoveFreeNotification(FActiveControl);
  FActiveControl = Value;
  if (Value) FreeNotification(Value);
}

void TCustomForm::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FActiveControl) FActiveControl = nullptr;
}

int TCustomForm::ClientWidth() const {
  TPoint Off = ClientOffset();
  return std::max(Width() - 2 * Off.X, 0);
}

int TCustomForm::ClientHeight() const {
  TPoint Off = ClientOffset();
  return std::max(Height() - Off.Y - Off.X, 0);
}

TPoint TCustomForm::ClientOffset() const {
  if (FBorderStyle == bsNone) return {0, 0};
  return {FormFrameWidth, FormFrameWidth + FormCaptionHeight};
}

void TCustomForm::Close() {
  TCloseAction Action = caHide;
  if (OnClose && !IsDesigning()) OnClose(this, Action);
  switch (Action) {
  case caHide: Hide(); break;
  case caFree: ReleaseForm(); break;
  default: break; // caNone keeps the form; a headless form cannot be minimised
  }
}

void TCustomForm::ReleaseForm() { PostMessage(this, CM_RELEASE, 0, 0); }

TMonitor* TCustomForm::Monitor() const { return Screen()->MonitorFromRect(BoundsRect()); }

void TCustomForm::WndProc(TMessage& Message) {
  switch (Message.Msg) {
  case CM_RELEASE:
    // Nothing may touch the form after this.
    Destroy();
    return;
  case CM_VISIBLECHANGED: {
    bool Shown = Message.WParam != 0;
    Screen()->FormVisibilityChanged(this, Shown);
    bool Live = !IsDesigning() && !IsLoading();
    if (Shown && Live && OnShow) OnShow(this);
    if (!Shown && Live && OnHide) OnHide(this);
    break;
  }
  default: break;
  }
  inherited::WndProc(Message);
}

void TCustomForm::ChangeScale(int M, int D, int NewPPI) {
  // A window keeps its place on the screen and its frame; only the client area scales.
  int W = MulDiv(ClientWidth(), M, D);
  int H = MulDiv(ClientHeight(), M, D);
  int L = Left();
  int T = Top();
  DisableAlign();
  // Enabling the layout lays the children out, which may fail: after a failure here that
  // one passes on, after success its own does.
  auto End = OnFailure([this]() noexcept { RunIgnoringExceptions([this] { EnableAlign(); }); });
  inherited::ChangeScale(M, D, NewPPI);
  SetBounds(L, T, Width(), Height());
  SetClientWidth(W);
  SetClientHeight(H);
  End.Dismiss();
  EnableAlign();
}

void TCustomForm::Loaded() {
  inherited::Loaded();
  // Numbers stored at another resolution are brought to the screen's when the form runs.
  if (FScaled && !IsDesigning() && PixelsPerInch() != Screen()->PixelsPerInch())
    ScaleForPPI(Screen()->PixelsPerInch());
}

void TCustomForm::GetChildren(const TGetChildProc& Proc, TComponent* Root) {
  inherited::GetChildren(Proc, Root);
  if (Root == this)
    for (TComponent* C : RootLevelComponents(this)) Proc(C);
}

void TCustomForm::SetChildOrder(TComponent* Child, int Order) {
  auto* C = dynamic_cast<TControl*>(Child);
  if (C && C->Parent() == this) inherited::SetChildOrder(Child, Order);
  else SetRootLevelOrder(this, Child, Order - OwnedControlCount(this, this));
}

FK_IMPLEMENT(TForm, "KilnForms") {}

//===----------------------------------------------------------------------===//
// Frames
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCustomFrame, "KilnForms") {
  detail::PublishAlign(B);
  detail::PublishColor(B, clBtnFace);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TCustomFrame::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csAcceptsControls, csClickEvents, csDoubleClicks});
  SetBounds(0, 0, 320, 240);
}

void TCustomFrame::GetChildren(const TGetChildProc& Proc, TComponent* Root) {
  inherited::GetChildren(Proc, Root);
  if (Root == this)
    for (TComponent* C : RootLevelComponents(this)) Proc(C);
}

void TCustomFrame::SetChildOrder(TComponent* Child, int Order) {
  auto* C = dynamic_cast<TControl*>(Child);
  if (C && C->Parent() == this) inherited::SetChildOrder(Child, Order);
  else SetRootLevelOrder(this, Child, Order - OwnedControlCount(this, this));
}

FK_IMPLEMENT(TFrame, "KilnForms") {}

//===----------------------------------------------------------------------===//
// TDataModule
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDataModule, "KilnForms") {}

void TDataModule::DefineProperties(TFiler* Filer) {
  inherited::DefineProperties(Filer);
  // Compared with the ancestor's, so an unchanged descendant writes none of them.
  auto* Anc = dynamic_cast<TDataModule*>(Filer->Ancestor());
  TPoint BaseSize = Anc ? Anc->FDesignSize : TPoint{};
  TPoint BaseOffset = Anc ? Anc->FDesignOffset : TPoint{};
  int BasePPI = Anc ? Anc->FDesignPPI : 0;
  auto Int = [Filer](const char* Name, int* Field, bool HasData) {
    Filer->DefineProperty(
        Name, [Field](TReader* R) { *Field = R->ReadInteger(); }, [Field](TWriter* W) { W->WriteInteger(*Field); },
        HasData);
  };
  Int("Height", &FDesignSize.Y, FDesignSize.Y != BaseSize.Y);
  Int("Width", &FDesignSize.X, FDesignSize.X != BaseSize.X);
  Int("HorizontalOffset", &FDesignOffset.X, FDesignOffset.X != BaseOffset.X);
  Int("VerticalOffset", &FDesignOffset.Y, FDesignOffset.Y != BaseOffset.Y);
  Int("PixelsPerInch", &FDesignPPI, FDesignPPI != BasePPI);
}

void TDataModule::GetChildren(const TGetChildProc& Proc, TComponent*) {
  for (TComponent* C : RootLevelComponents(this)) Proc(C);
}

void TDataModule::SetChildOrder(TComponent* Child, int Order) { SetRootLevelOrder(this, Child, Order); }

//===----------------------------------------------------------------------===//
// Screen
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMonitor, "KilnForms") {}

FK_IMPLEMENT(TScreen, "KilnForms") {}

TScreen::TScreen() {
  SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), DefaultPPI, true}});
}

void TScreen::BeforeDestruction() {
  ClearMonitors();
  inherited::BeforeDestruction();
}

TCustomForm* TScreen::Forms(int Index) const {
  if (Index < 0 || Index >= FormCount()) throw EListError(SFormIndexError, Index);
  return FForms[static_cast<std::size_t>(Index)];
}

void TScreen::AddForm(TCustomForm* Form) { FForms.push_back(Form); }

void TScreen::RemoveForm(TCustomForm* Form) noexcept {
  std::erase(FForms, Form);
  FormVisibilityChanged(Form, false);
}

void TScreen::FormVisibilityChanged(TCustomForm* Form, bool Visible) noexcept {
  std::erase(FShown, Form);
  // Out of memory, a form that shows is simply not tracked as shown.
  if (Visible) RunIgnoringExceptions([&] { FShown.push_back(Form); });
  FActiveForm = FShown.empty() ? nullptr : FShown.back();
}

TMonitor* TScreen::Monitors(int Index) const {
  if (Index < 0 || Index >= MonitorCount()) throw EListError(SMonitorIndexError, Index);
  return FMonitors[static_cast<std::size_t>(Index)].Get();
}

TMonitor* TScreen::PrimaryMonitor() const {
  for (const TObjectGuard<TMonitor>& M : FMonitors)
    if (M->Primary()) return M.Get();
  return FMonitors.front().Get();
}

void TScreen::ClearMonitors() noexcept { FMonitors.clear(); }

void TScreen::SetMonitors(const std::vector<TMonitorInfo>& Monitors) {
  if (Monitors.empty()) throw EInvalidOperation(SNoMonitors);
  bool AnyPrimary = false;
  for (std::size_t I = 0; I < Monitors.size(); ++I) {
    const TMonitorInfo& M = Monitors[I];
    TRect Inside;
    bool WorkInside = !M.WorkareaRect.IsEmpty() && IntersectRect(Inside, M.WorkareaRect, M.BoundsRect) &&
                      Inside == M.WorkareaRect;
    if (M.BoundsRect.IsEmpty() || !WorkInside || M.PixelsPerInch < 1)
      throw EInvalidOperation(SInvalidMonitor, static_cast<int>(I));
    AnyPrimary = AnyPrimary || M.Primary;
  }
  std::vector<TObjectGuard<TMonitor>> Made;
  Made.reserve(Monitors.size());
  for (std::size_t I = 0; I < Monitors.size(); ++I) {
    TObjectGuard<TMonitor> M(new TMonitor);
    M->FNum = static_cast<int>(I);
    M->FInfo = Monitors[I];
    // Exactly one primary: the first one marked, or the first one.
    bool Primary = AnyPrimary ? Monitors[I].Primary : I == 0;
    for (const TObjectGuard<TMonitor>& Earlier : Made)
      if (Earlier->FInfo.Primary) Primary = false;
    M->FInfo.Primary = Primary;
    Made.push_back(std::move(M));
  }
  ClearMonitors();
  FMonitors = std::move(Made);
}

namespace {
long long DistanceSquared(const TRect& R, TPoint P) {
  long long DX = P.X < R.Left ? R.Left - P.X : (P.X >= R.Right ? P.X - (R.Right - 1) : 0);
  long long DY = P.Y < R.Top ? R.Top - P.Y : (P.Y >= R.Bottom ? P.Y - (R.Bottom - 1) : 0);
  return DX * DX + DY * DY;
}
} // namespace

TMonitor* TScreen::MonitorFromPoint(TPoint P, TMonitorDefaultTo Default) const {
  for (const TObjectGuard<TMonitor>& M : FMonitors)
    if (M->BoundsRect().Contains(P)) return M.Get();
  if (Default == mdNull) return nullptr;
  if (Default == mdPrimary) return PrimaryMonitor();
  TMonitor* Best = FMonitors.front().Get();
  for (const TObjectGuard<TMonitor>& M : FMonitors)
    if (DistanceSquared(M->BoundsRect(), P) < DistanceSquared(Best->BoundsRect(), P)) Best = M.Get();
  return Best;
}

TMonitor* TScreen::MonitorFromRect(const TRect& R, TMonitorDefaultTo Default) const {
  TMonitor* Best = nullptr;
  long long BestArea = 0;
  for (const TObjectGuard<TMonitor>& M : FMonitors) {
    TRect I;
    if (!IntersectRect(I, R, M->BoundsRect())) continue;
    long long Area = static_cast<long long>(I.Width()) * I.Height();
    if (Area > BestArea) {
      Best = M.Get();
      BestArea = Area;
    }
  }
  if (Best || Default == mdNull) return Best;
  if (Default == mdPrimary) return PrimaryMonitor();
  return MonitorFromPoint({R.Left + R.Width() / 2, R.Top + R.Height() / 2}, mdNearest);
}

TRect TScreen::DesktopRect() const {
  TRect R;
  for (const TObjectGuard<TMonitor>& M : FMonitors) R = UnionRect(R, M->BoundsRect());
  return R;
}

namespace {
TScreen*& ScreenInstance() {
  static TScreen* S = nullptr;
  return S;
}
} // namespace

namespace detail {
void FreeScreen() noexcept { FreeAndNil(ScreenInstance()); }
} // namespace detail

TScreen* Screen() {
  TScreen*& S = ScreenInstance();
  if (!S) S = new TScreen;
  return S;
}

} // namespace formkit
