//===- frameworks/kiln/design/KilnRoot.cpp - A Kiln module on design -----===//
#include "frameworks/kiln/design/KilnDesign.h"

#include "frameworks/kiln/KilnClipbrd.h"
#include "frameworks/kiln/design/RecoveryDialogs.h"
#include "platform/Filer.h"

namespace formkit {

FK_IMPLEMENT(TKilnRoot, "KilnDesign") {}
FK_IMPLEMENT(TKilnTools, "KilnDesign") {}

bool TKilnTools::ToolSelected() {
  IPtr<IDesignEnvironment> Env = FRoot ? FRoot->GetEnvironment() : nullptr;
  IPtr<IOTABasePaletteItem> Tool;
  if (Env) Env->GetToolSelected(Tool);
  return static_cast<bool>(Tool);
}

namespace {
/// Default client size of a new form's design window.
constexpr int NewFormWidth = 640;
constexpr int NewFormHeight = 480;
} // namespace

void TKilnRoot::LinkDesigner(TComponent* Instance, bool Link) {
  IDesignerNotify* Designer = Link ? static_cast<IDesigner*>(this) : nullptr;
  if (auto* Form = dynamic_cast<TCustomForm*>(Instance)) Form->SetDesigner(Designer);
  else if (auto* Frame = dynamic_cast<TCustomFrame*>(Instance)) Frame->SetDesigner(Designer);
  else if (auto* Module = dynamic_cast<TDataModule*>(Instance)) Module->SetDesigner(Designer);
}

void TKilnRoot::InitRootInstance(TComponent* Instance) { LinkDesigner(Instance, true); }

void TKilnRoot::InitNewRoot(TComponent* Instance, const String&) {
  if (auto* Form = dynamic_cast<TCustomForm*>(Instance)) {
    Form->SetClientWidth(NewFormWidth);
    Form->SetClientHeight(NewFormHeight);
  } else if (auto* Module = dynamic_cast<TDataModule*>(Instance)) {
    // A new data module's window opens at the size of the stored one.
    Module->SetDesignSize(TDataModuleForm::StoredSize());
  }
}

void TKilnRoot::NewRootCreated(TComponent* Instance, const String&) {
  // A new form's caption is its name.
  if (auto* Control = dynamic_cast<TControl*>(Instance)) Control->SetCaption(Instance->Name());
}

void TKilnRoot::RootInstanceReady() {
  // The window that shows the module: a form shows itself; a frame or a data module is
  // shown in the window its custom module makes, or else in a plain one.
  FWindowRoot = FRoot;
  if (auto* Form = dynamic_cast<TCustomForm*>(FRoot)) {
    FWindow = Form;
    FOwnWindow = false;
    FContainer = Form;
    return;
  }
  if (auto WindowMaker = QueryAs<ICustomDesignForm>(GetCustomModule())) {
    TCustomForm* Window = nullptr;
    TWinControl* Container = nullptr;
    WindowMaker->CreateDesignerForm(AsDesigner(), FRoot, Window, Container);
    if (Window) {
      FWindow = Window;
      FOwnWindow = true;
      FContainer = Container ? Container : Window;
      return;
    }
  }
  FWindow = CreateComponentOf<TForm>(nullptr);
  FOwnWindow = true;
  FContainer = FWindow;
  if (auto* Frame = dynamic_cast<TCustomFrame*>(FRoot)) {
    Frame->SetParent(FWindow);
    FContainer = Frame;
  }
}

void TKilnRoot::InitializeSurface() {
  IPtr<TKilnSurface> Surface = New<TKilnSurface>(this, FContainer ? FContainer : FWindow);
  Surface->Create(AsDesigner(), FRoot, AsSurfaceHost());
  FKilnSurface = Surface.Get();
  FSurface = InterfaceOf<IComponentDesignSurface>(Surface.Get());
  IPtr<TDesigner> Engine =
      New<TDesigner>(IPtr<IDesignSurface>(FSurface), SelectionItems(), NewAs<ITools, TKilnTools>(this));
  FSurfaceDesigner = InterfaceOf<ISurfaceDesigner>(Engine.Get());
}

void TKilnRoot::TearDownRoot() {
  FKilnSurface = nullptr;
  if (FRoot) LinkDesigner(FRoot, false);
  if (FOwnWindow && FWindow) {
    // Neither the module's root nor its frame is the window's to free.
    if (TComponent* Root = FWindowRoot) {
      if (Root->Owner() == FWindow) FWindow->RemoveComponent(Root);
      if (auto* Control = dynamic_cast<TControl*>(Root); Control && Control->Parent()) Control->SetParent(nullptr);
    }
    FreeAndNil(FWindow);
  }
  FWindow = nullptr;
  FContainer = nullptr;
  FWindowRoot = nullptr;
  FOwnWindow = false;
}

void TKilnRoot::DestroyRootInstance(TComponent* Instance) { Instance->Destroy(); }

void TKilnRoot::HideRootWindow() {
  if (FWindow) FWindow->Hide();
}

void TKilnRoot::ShowRootWindow() {
  if (FWindow) FWindow->Show();
}

void TKilnRoot::ShowRootWindowAs(TShowState State) {
  if (!FWindow) return;
  if (State == ssMinimized) FWindow->Hide();
  else FWindow->Show();
}

TComponent* TKilnRoot::RootOf(TComponent* Component) {
  // The module's root may stand in its design window's components: it is still the top.
  TComponent* Top = Component;
  while (Top && Top != FRoot && Top->Owner()) Top = Top->Owner();
  return Top;
}

int TKilnRoot::GetControlCount(TComponent* Component) {
  auto* Win = dynamic_cast<TWinControl*>(Component);
  return Win ? Win->ControlCount() : 0;
}

TComponent* TKilnRoot::GetControl(TComponent* Component, int Index) {
  auto* Win = dynamic_cast<TWinControl*>(Component);
  return Win ? Win->Controls(Index) : nullptr;
}

bool TKilnRoot::IsControl(TComponent* Component) { return dynamic_cast<TControl*>(Component) != nullptr; }

TComponent* TKilnRoot::GetParent(TComponent* Component) {
  auto* Control = dynamic_cast<TControl*>(Component);
  return Control ? Control->Parent() : nullptr;
}

void TKilnRoot::FrameComponentAdded(TComponent* Component) {
  // What a nested frame brings shows on the surface like the module's own components;
  // a non-visual one gets its icon.
  if (FKilnSurface && !dynamic_cast<TControl*>(Component)) FKilnSurface->UpdateSurface();
}

//===----------------------------------------------------------------------===//
// Questions, the clipboard, pasted places
//===----------------------------------------------------------------------===//

TRootReadErrorResult TKilnRoot::AskReadError(const String& Message) {
  if (ReadErrorAnswer) return ReadErrorAnswer(Message);
  switch (FormReadError(Message, ChangeFileExt(ExtractFileName(FFileName), ""))) {
  case mrOk: return rerOK;
  case mrIgnoreAll: return rerIgnoreAll;
  default: return rerCancel;
  }
}

TRecoveryResult TKilnRoot::AskAncestorRecovery(const String& RootName, const String& AncestorName, String& NewName,
                                               const String& Candidates, bool Nested) {
  if (AncestorRecoveryAnswer) return AncestorRecoveryAnswer(RootName, AncestorName, NewName, Candidates, Nested);
  return FormInheritenceRecovery(RootName, AncestorName, NewName, Candidates, Nested);
}

TQueryRedirectLinksResult TKilnRoot::AskRedirectLinks(const String& RootName, const String& LinkedName) {
  if (RedirectLinksAnswer) return RedirectLinksAnswer(RootName, LinkedName);
  switch (MessageDlgPos(Format(LoadResString(sRedirectLinks), RootName, LinkedName), mtConfirmation,
                        {mbYes, mbNo, mbCancel}, 0, -1, -1)) {
  case mrYes: return qrYes;
  case mrNo: return qrNo;
  default: return qrCancel;
  }
}

void TKilnRoot::RedirectLinks(TComponent* Root, const String& LinkedName) {
  if (!RedirectTarget) return formkit::RedirectLinks(Root, LinkedName);
  String Target = RedirectTarget(Root, LinkedName);
  if (Target.empty()) RemoveFixupReferences(Root, LinkedName);
  else RedirectFixupReferences(Root, LinkedName, Target);
}

namespace {
/// The Kiln clipboard by format name.
class TKilnDesignClipboard final : public TDesignClipboard {
public:
  void Open() override { formkit::Clipboard()->Open(); }
  void Close() override { formkit::Clipboard()->Close(); }
  bool HasFormat(const String& Name) override { return formkit::Clipboard()->HasFormat(RegisterClipboardFormat(Name)); }
  void SetBytes(const String& Name, const std::vector<std::uint8_t>& Bytes) override {
    formkit::Clipboard()->SetAsHandle(RegisterClipboardFormat(Name), Bytes);
  }
  std::vector<std::uint8_t> GetBytes(const String& Name) override {
    return formkit::Clipboard()->GetAsHandle(RegisterClipboardFormat(Name));
  }
  bool HasText() override { return formkit::Clipboard()->HasFormat(CF_TEXT); }
  void SetText(const String& Text) override { formkit::Clipboard()->SetAsText(Text); }
  String GetText() override { return formkit::Clipboard()->AsText(); }
};
} // namespace

TDesignClipboard& TKilnRoot::Clipboard() {
  static TKilnDesignClipboard Board;
  return Board;
}

bool TKilnRoot::CanNestClass(TClass Class) { return Class && Class->InheritsFrom(TCustomFrame::StaticClass()); }

TClass TKilnRoot::GetClassGroup() { return TControl::StaticClass(); }

void TKilnRoot::AdjustReadComponent(TComponent* Component, const TRect& Rect, const TRect& Bounds) {
  auto* Control = dynamic_cast<TControl*>(Component);
  if (Rect.IsEmpty() || Bounds.IsEmpty()) return;
  int DX = Rect.Left - Bounds.Left, DY = Rect.Top - Bounds.Top;
  if (Control) {
    Control->SetBounds(Control->Left() + DX, Control->Top() + DY, Control->Width(), Control->Height());
    return;
  }
  std::int32_t Info = Component->DesignInfo();
  auto Left = static_cast<std::int16_t>(Info & 0xFFFF), Top = static_cast<std::int16_t>(Info >> 16);
  Component->SetDesignInfo(static_cast<std::int32_t>(static_cast<std::uint16_t>(Left + DX)) |
                           (static_cast<std::int32_t>(static_cast<std::uint16_t>(Top + DY)) << 16));
}

TDeleteWarnResult TKilnRoot::AskDeleteWarning(const String& ComponentName, const String& Names) {
  String Question = Format(LoadResString(sAncestorDeleteWarning), ComponentName, Names);
  if (DeleteWarningAnswer) return DeleteWarningAnswer(Question);
  switch (MessageDlgPos(Question, mtConfirmation, {mbYes, mbNo, mbCancel}, 0, -1, -1)) {
  case mrYes: return dwYes;
  case mrNo: return dwNo;
  default: return dwCancel;
  }
}

namespace {
/// Mirrors the children of `Parent` within its client width; with `AllLevels` their
/// children too.
void MirrorChildren(TWinControl* Parent, bool AllLevels) {
  int Width = Parent->ClientWidth();
  for (int I = 0; I < Parent->ControlCount(); ++I) {
    TControl* C = Parent->Controls(I);
    C->SetBounds(Width - C->Left() - C->Width(), C->Top(), C->Width(), C->Height());
    if (auto* W = dynamic_cast<TWinControl*>(C); W && AllLevels) MirrorChildren(W, true);
  }
}
} // namespace

void TKilnRoot::FlipRootChildren(bool AllChildren) {
  if (AllChildren) {
    if (auto* Form = dynamic_cast<TWinControl*>(FRoot)) MirrorChildren(Form, true);
  } else {
    IPtr<IDesignerSelections> Selected = GetSelection();
    for (int I = 0; I < Selected->GetCount(); ++I)
      if (auto* W = dynamic_cast<TWinControl*>(Selected->Get(I))) MirrorChildren(W, false);
  }
  Modified();
}

//===----------------------------------------------------------------------===//
// Owners of controls in nested frames
//===----------------------------------------------------------------------===//

namespace {
/// A name for `Component` that `Owner` does not hold yet: its own, or its class's with
/// the first free number.
String FreeNameIn(TComponent* Owner, TComponent* Component) {
  if (!Owner->FindComponent(Component->Name())) return Component->Name();
  String Base = Component->ClassName().substr(1);
  for (int N = 1;; ++N)
    if (String Name = Base + IntToStr(N); !Owner->FindComponent(Name)) return Name;
}
} // namespace

TComponent* TKilnRoot::OwnerWithin(TWinControl* Parent) const {
  for (TWinControl* P = Parent; P && P != FRoot; P = P->Parent())
    if (P->ComponentState().Contains(csInline) && ModifiableFrame(P)) return P;
  return FRoot;
}

void TKilnRoot::KeepOwnerWithParent(TControl* Control) {
  TComponent* Owner = Control->Owner();
  if (!Owner || !Control->Parent() || Control->ComponentState().Contains(csAncestor)) return;
  if (Owner != FRoot && !ModifiableFrame(Owner)) return;
  TComponent* NewOwner = OwnerWithin(Control->Parent());
  if (NewOwner == Owner) return;
  String Name = FreeNameIn(NewOwner, Control);
  Owner->RemoveComponent(Control);
  if (Name != Control->Name()) Control->ChangeName(Name);
  NewOwner->InsertComponent(Control);
}

//===----------------------------------------------------------------------===//
// Previews
//===----------------------------------------------------------------------===//

namespace {
void DrawControls(TCanvas* Canvas, TWinControl* Parent, TPoint Origin) {
  for (int I = 0; I < Parent->ControlCount(); ++I) {
    TControl* C = Parent->Controls(I);
    TRect R = C->BoundsRect();
    R.Offset(Origin.X, Origin.Y);
    Canvas->Rectangle(R);
    Canvas->TextOut(R.Left + 2, R.Top + 2, C->Name());
    if (auto* W = dynamic_cast<TWinControl*>(C)) DrawControls(Canvas, W, R.TopLeft());
  }
}
} // namespace

void TKilnRoot::GetViewPreview(TPersistent* Bitmap) {
  auto* Target = dynamic_cast<TBitmap*>(Bitmap);
  auto* Form = dynamic_cast<TWinControl*>(FRoot);
  if (!Target || !Form) return;
  Target->SetSize(Form->ClientWidth(), Form->ClientHeight());
  TCanvas* Canvas = Target->Canvas();
  Canvas->Brush()->SetColor(Form->Color());
  Canvas->FillRect(Rect(0, 0, Target->Width(), Target->Height()));
  DrawControls(Canvas, Form, {0, 0});
  FGeneratePreview = false;
}

void TKilnRoot::RenderViewPreview(const String& ViewName, TPersistent* Bitmap) {
  auto* Target = dynamic_cast<TBitmap*>(Bitmap);
  if (!Target) return;
  if (Target->Width() == 0 || Target->Height() == 0)
    if (auto* Form = dynamic_cast<TControl*>(FRoot)) Target->SetSize(Form->Width(), Form->Height());
  Target->Canvas()->FrameRect(Rect(0, 0, Target->Width(), Target->Height()));
  Target->Canvas()->TextOut(4, 4, ViewName);
}

TKilnSurface* KilnSurfaceOf(const IPtr<IRoot>& Root) {
  auto Internal = QueryAs<IInternalRoot>(Root);
  auto* Kiln = Internal ? dynamic_cast<TKilnRoot*>(Internal->Implementor()) : nullptr;
  return Kiln ? Kiln->KilnSurface() : nullptr;
}

} // namespace formkit
