//===- desktop/DeskWindows.cpp - Showing, focusing and hiding windows ----===//
#include "desktop/DeskForm.h"
#include "desktop/DockHostForms.h"

#include <algorithm>
#include <memory>

namespace formkit {

std::function<TCustomForm*(TCustomForm*, TWinControl*)> ShowDockClientHook;

namespace {
/// The classes registered as design forms or as default forms, the forms hidden by
/// `HideDesignForms` (each forgotten when it goes), and the two events.
class TDesignFormTables : public TComponent {
  FK_CLASS(TDesignFormTables, TComponent)
public:
  std::vector<TClass> DesignClasses;
  std::vector<TClass> DefaultClasses;
  std::vector<TCustomForm*> Hidden;
  TObjectGuard<TEvent> HideEvent{new TEvent};
  TObjectGuard<TEvent> ShowEvent{new TEvent};

  void Remember(TCustomForm* Form) {
    Hidden.reserve(Hidden.size() + 1);
    FreeNotification(Form);
    Hidden.push_back(Form);
  }
  void Forget(TCustomForm* Form) {
    std::erase(Hidden, Form);
    RemoveFreeNotification(Form);
  }

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override {
    inherited::Notification(AComponent, Operation);
    if (Operation != opRemove) return;
    if (auto* F = dynamic_cast<TCustomForm*>(AComponent)) std::erase(Hidden, F);
  }
};

TDesignFormTables*& TablesInstance() {
  static TDesignFormTables* T = nullptr;
  return T;
}

TDesignFormTables* Tables() {
  TDesignFormTables*& T = TablesInstance();
  if (!T) T = CreateComponentOf<TDesignFormTables>(nullptr);
  return T;
}

bool IsOfAny(const TObject* Obj, const std::vector<TClass>& Classes) {
  return std::any_of(Classes.begin(), Classes.end(), [Obj](TClass C) { return Obj->InheritsFrom(C); });
}

/// Some parent of `C`, at any height, is hidden.
bool HasHiddenParent(const TControl* C) {
  for (const TControl* P = C->Parent(); P; P = P->Parent())
    if (!P->Visible()) return true;
  return false;
}

int GDesktopStarts = 0;
/// The top-level form that last had the focus, as the hook saw it.
TCustomForm* GLastFocusedForm = nullptr;

bool FormExists(const TCustomForm* Form) {
  for (int I = 0; I < Screen()->FormCount(); ++I)
    if (Screen()->Forms(I) == Form) return true;
  return false;
}
} // namespace

FK_IMPLEMENT(TDesignFormTables, "DeskUtil") {}

//===----------------------------------------------------------------------===//
// Starting and stopping
//===----------------------------------------------------------------------===//

std::vector<String> SplitAtCommas(const String& Text) {
  std::vector<String> Parts;
  std::size_t Pos = 0;
  while (Pos <= Text.size()) {
    std::size_t Comma = std::min(Text.find(',', Pos), Text.size());
    Parts.push_back(Text.substr(Pos, Comma - Pos));
    Pos = Comma + 1;
  }
  return Parts;
}

void InitializeDesktop() {
  if (GDesktopStarts++ > 0) return;
  // Drops make tab and join hosts, and a desktop may name the host class, from the start.
  RegisterDockHostForms();
  FocusHook = [](TCustomForm* Form) {
    if (Form != Application()->MainForm()) GLastFocusedForm = Form;
  };
}

void FinalizeDesktop() {
  if (GDesktopStarts == 0 || --GDesktopStarts > 0) return;
  FocusHook = nullptr;
  GLastFocusedForm = nullptr;
  UnregisterDockHostForms();
  FreeAndNil(TablesInstance());
}

//===----------------------------------------------------------------------===//
// Design and default forms
//===----------------------------------------------------------------------===//

void RegisterDesignForm(TClass AClass) { Tables()->DesignClasses.push_back(AClass); }
void UnregisterDesignForm(TClass AClass) { std::erase(Tables()->DesignClasses, AClass); }
TEvent* HideDesignFormsEvent() { return Tables()->HideEvent.Get(); }
TEvent* ShowDesignFormsEvent() { return Tables()->ShowEvent.Get(); }

void HideDesignForms() {
  TDesignFormTables* T = Tables();
  for (int I = 0; I < Screen()->FormCount(); ++I) {
    TCustomForm* F = Screen()->Forms(I);
    if (!IsOfAny(F, T->DesignClasses) || !F->Visible() || HasHiddenParent(F)) continue;
    T->Remember(F);
    F->SetDefaultMonitor(dmDesktop);
  }
  for (TCustomForm* F : T->Hidden) F->Hide();
  T->HideEvent->Send(nullptr);
}

void ShowDesignForms() {
  TDesignFormTables* T = Tables();
  while (!T->Hidden.empty()) {
    TCustomForm* F = T->Hidden.back();
    T->Forget(F);
    ShowDockableForm(F);
    F->SetDefaultMonitor(dmActiveForm);
  }
  T->ShowEvent->Send(nullptr);
}

void RegisterDefaultForm(TClass AClass) { Tables()->DefaultClasses.push_back(AClass); }
void UnregisterDefaultForm(TClass AClass) { std::erase(Tables()->DefaultClasses, AClass); }

void ShowDefaultForms() {
  std::vector<TClass> Classes = Tables()->DefaultClasses;
  for (int I = 0; I < Screen()->FormCount(); ++I)
    if (IsOfAny(Screen()->Forms(I), Classes)) Screen()->Forms(I)->Show();
}

//===----------------------------------------------------------------------===//
// Windows
//===----------------------------------------------------------------------===//

TCustomForm* ShowDockableForm(TCustomForm* AForm) {
  if (!AForm) return nullptr;
  TCustomForm* Form = AForm;
  // Up through the hosts: each docked window is made visible in its host.
  while (TWinControl* Host = HostDockSite(Form)) {
    Form->SetVisible(true);
    TCustomForm* Next = ShowDockClientHook ? ShowDockClientHook(Form, Host) : nullptr;
    if (!Next) Next = GetParentForm(Host);
    if (!Next || Next == Form) break;
    Form = Next;
  }
  Form->SetVisible(true);
  return Form;
}

TCustomForm* FocusWindow(TCustomForm* AForm) {
  if (!AForm) return nullptr;
  bool Freeze = !TIDEDesktopService::IsDrawingLocked();
  if (Freeze) TIDEDesktopService::LockDrawing();
  auto Thaw = Finally([Freeze]() noexcept {
    if (Freeze) RunIgnoringExceptions([] { TIDEDesktopService::UnLockDrawing(); });
  });
  TCustomForm* Shown = ShowDockableForm(AForm);
  if (Shown->WindowState() == wsMinimized) Shown->SetWindowState(wsNormal);
  Shown->Activate();
  TWinControl* Target = AForm;
  if (AForm->Parent())
    for (TWinControl* W : AForm->TabList())
      if (W->TabStop() && W->Visible() && W->Enabled()) {
        Target = W;
        break;
      }
  SetFocus(Target);
  return Shown;
}

TCustomForm* GetTopWindow() {
  if (TCustomForm* Active = Screen()->ActiveForm()) return Active;
  if (GLastFocusedForm && FormExists(GLastFocusedForm)) return GLastFocusedForm;
  for (int I = Screen()->FormCount() - 1; I >= 0; --I) {
    TCustomForm* F = Screen()->Forms(I);
    if (F->Visible() && !F->Parent() && F->WindowState() != wsMinimized && F->Owner() == Application() &&
        F != Application()->MainForm())
      return F;
  }
  return nullptr;
}

TCustomForm* GetImmediateDesktopForm(TCustomForm* AForm) {
  TControl* C = GetFocus();
  if (!AForm || !C || !C->HasAncestor(AForm)) return AForm;
  for (; C; C = C->Parent())
    if (auto* D = dynamic_cast<TDesktopForm*>(C)) return D;
  return AForm;
}

TPoint GetWorkspaceOrigin() {
  TControl* L = WorkspaceReferenceLeft;
  TControl* T = WorkspaceReferenceTop;
  if (!L || !T) return Screen()->WorkAreaRect().TopLeft();
  TCustomForm* LeftForm = GetParentForm(L);
  TRect LeftBounds = LeftForm ? LeftForm->BoundsRect() : L->BoundsRect();
  TMonitor* LeftMonitor = Screen()->MonitorFromRect(LeftBounds);
  int Middle = LeftMonitor->Left() + LeftMonitor->Width() / 2;
  TPoint TopOrigin = T->ClientToScreen({0, 0});
  int X = LeftBounds.Right < Middle ? LeftBounds.Right : TopOrigin.X;
  int Y = T->Height() + TopOrigin.Y;
  TMonitor* TopMonitor = Screen()->MonitorFromPoint(TopOrigin);
  if (TopOrigin.Y >= TopMonitor->Top() + TopMonitor->Height() / 2) Y = 10;
  return {X, Y};
}

void SetShowCaptionsToolBar(TCustomForm* AForm, TToolBar* AToolBar, bool AShow) {
  if (AToolBar->ShowCaptions() == AShow) return;
  TToolbarMetrics M = ToolbarMetrics();
  AToolBar->SetShowCaptions(AShow);
  int Height = M.ButtonHeight, Width = M.ButtonWidth, BarHeight = M.SmallToolbarSize;
  if (AShow) {
    // The caption's line of text grows with the resolution; the image above it does not.
    constexpr int CaptionLine = 13;
    int PPI = AForm->CurrentPPI();
    Height = MulDiv(CaptionLine, PPI, DefaultPPI) + M.CaptionButtonHeight - CaptionLine;
    Width = MulDiv(M.CaptionButtonWidth, PPI, DefaultPPI);
    BarHeight = Height + 8;
  }
  AToolBar->SetButtonHeight(Height);
  AToolBar->SetButtonWidth(Width);
  AToolBar->SetHeight(BarHeight);
  AToolBar->SetShowHint(!AShow);
}

namespace {
int GDisableCount = 0;
} // namespace

/// The windows `DisableDesktop` turned off and the cursor before it.
struct TDisabledDesktop {
  std::vector<TCustomForm*> Forms;
  TCursor Cursor = crDefault;
};

void TDisabledDesktopDeleter::operator()(TDisabledDesktop* List) const noexcept { delete List; }

TDisabledDesktopList DisableDesktop() {
  if (GDisableCount++ > 0) return nullptr;
  auto Undo = OnFailure([]() noexcept { --GDisableCount; });
  TDisabledDesktopList List(new TDisabledDesktop);
  List->Cursor = Screen()->Cursor();
  for (int I = 0; I < Screen()->FormCount(); ++I) {
    TCustomForm* F = Screen()->Forms(I);
    if (F->Visible() && F->Enabled() && !F->Parent()) List->Forms.push_back(F);
  }
  for (TCustomForm* F : List->Forms) F->SetEnabled(false);
  Screen()->SetCursor(crHourGlass);
  return List;
}

void EnableDesktop(TDisabledDesktopList AList) {
  if (GDisableCount > 0) --GDisableCount;
  if (!AList) return;
  for (TCustomForm* F : AList->Forms)
    if (FormExists(F)) F->SetEnabled(true);
  Screen()->SetCursor(AList->Cursor);
}

} // namespace formkit
