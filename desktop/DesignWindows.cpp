//===- desktop/DesignWindows.cpp - Editor windows beside a designer ------===//
#include "desktop/DesignWindows.h"

#include "core/DesignIntfClasses.h"
#include "core/Designers.h"
#include "core/root/ComponentRoot.h"
#include "platform/Filer.h"

#include <algorithm>

namespace formkit {

//===----------------------------------------------------------------------===//
// The link
//===----------------------------------------------------------------------===//

/// What the design core and the inspector hold of a design window, as its notification
/// listener, its edit handler and the window to activate again: a counted object that
/// passes each call on while the window lives.
class TDesignWindowLink : public TInterfacedObject, public IDesignWindow, public IActivatable, public IEditHandler {
  FK_CLASS(TDesignWindowLink, TInterfacedObject)
  FK_INTERFACES(IDesignWindow, IActivatable, IEditHandler)
public:
  explicit TDesignWindowLink(TDesignWindow* Window) : FWindow(Window) {}
  /// The window goes: nothing is passed on any more.
  void Detach() noexcept { FWindow = nullptr; }

  void ItemDeleted(const IPtr<IDesigner>& D, TPersistent* Item) override {
    if (FWindow) FWindow->ItemDeleted(D, Item);
  }
  void ItemInserted(const IPtr<IDesigner>& D, TPersistent* Item) override {
    if (FWindow) FWindow->ItemInserted(D, Item);
  }
  void ItemsModified(const IPtr<IDesigner>& D) override {
    if (FWindow) FWindow->ItemsModified(D);
  }
  void SelectionChanged(const IPtr<IDesigner>& D, const IPtr<IDesignerSelections>& S) override {
    if (FWindow) FWindow->SelectionChanged(D, S);
  }
  void DesignerOpened(const IPtr<IDesigner>& D, bool Resurrecting) override {
    if (FWindow) FWindow->DesignerOpened(D, Resurrecting);
  }
  void DesignerClosed(const IPtr<IDesigner>& D, bool GoingDormant) override {
    if (FWindow) FWindow->DesignerClosed(D, GoingDormant);
  }
  void WindowHide() override {
    if (FWindow) FWindow->WindowHide();
  }
  void WindowShow() override {
    if (FWindow) FWindow->WindowShow();
  }
  void Activated() override {
    if (FWindow) FWindow->Activated();
  }
  bool EditAction(TEditAction Action) override { return FWindow && FWindow->EditAction(Action); }
  TEditState GetEditState() override { return FWindow ? FWindow->GetEditState() : TEditState(); }

private:
  TDesignWindow* FWindow;
};

FK_IMPLEMENT(TDesignWindowLink, "DesignWindows") {}

//===----------------------------------------------------------------------===//
// TDesignWindow
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDesignWindow, "DesignWindows") {}

TDesignWindowLink* TDesignWindow::Link() const noexcept { return static_cast<TDesignWindowLink*>(FLink.Get()); }

void TDesignWindow::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FLink = New<TDesignWindowLink>(this);
  RegisterDesignNotification(FLink);
}

void TDesignWindow::BeforeDestruction() {
  FComponentDesigner = nullptr;
  if (FLink) {
    RunIgnoringExceptions([this] { UnregisterDesignNotification(FLink); });
    Link()->Detach();
  }
  inherited::BeforeDestruction();
}

void TDesignWindow::SetDesigner(const IPtr<IDesigner>& ADesigner) {
  if (ADesigner == FDesigner) return;
  FDesigner = ADesigner;
  if (!FDesigner || FComponentDesigner) return;
  if (auto Ext = QueryAs<IDesigner100>(FDesigner); Ext && Designers())
    FComponentDesigner = Designers()->DesignerFromExtension(Ext->GetDesignerExtension());
  TRect Main;
  if (FComponentDesigner)
    if (IPtr<IDesignEnvironment> Env = FComponentDesigner->GetEnvironment()) Env->GetMainWindowSize(Main);
  SetBounds(200, Main.Bottom + 2, Width(), Height());
}

void TDesignWindow::WindowHide() {
  if (Visible()) ShowWindow(this, SW_HIDE);
}

void TDesignWindow::WindowShow() {
  if (!Visible()) return;
  std::uint32_t Cmd = SW_SHOWNORMAL;
  if (WindowState() == wsMaximized) Cmd = SW_SHOWMAXIMIZED;
  else if (WindowState() == wsMinimized) Cmd = SW_SHOWMINIMIZED;
  ShowWindow(this, Cmd);
}

void TDesignWindow::WndProc(TMessage& Message) {
  inherited::WndProc(Message);
  if (Message.Msg != WM_ACTIVATE) return;
  FActive = Message.WParam != 0;
  if (FActive) Activated();
}

void TDesignWindow::ActivateInspector(char AChar) {
  if (auto D = QueryAs<IDesigner80>(FDesigner)) D->ModalEdit(AChar, IPtr<IActivatable>(Link()));
}

void TDesignWindow::SetSelection(const IPtr<IDesignerSelections>& ASelection) {
  if (FComponentDesigner)
    FComponentDesigner->SetSelection(FDesigner, QueryAs<IInterface>(FLink.Get()), ASelection);
}

String TDesignWindow::UniqueName(TComponent* AComponent) { return FDesigner->UniqueName(AComponent->ClassName()); }

//===----------------------------------------------------------------------===//
// The clipboard
//===----------------------------------------------------------------------===//

TComponentRoot* TDesignWindow::DesignRoot() const {
  auto Internal = QueryAs<IInternalRoot>(FDesigner);
  auto* Root = Internal ? dynamic_cast<TComponentRoot*>(Internal->Implementor()) : nullptr;
  if (!Root) throw EInvalidOperation(sDesignWindowNoModule);
  return Root;
}

bool TDesignWindow::ClipboardComponents() noexcept {
  try {
    TDesignClipboard& Board = DesignRoot()->Clipboard();
    return Board.HasFormat(CF_COMPONENTS_NAME) || (Board.HasText() && TComponentRoot::PossibleStream(Board.GetText()));
  } catch (...) {
    return false;
  }
}

void TDesignWindow::CopyComponents(TComponent* ARoot, const IPtr<IDesignerSelections>& ASelection) {
  TComponentRoot* Module = DesignRoot();
  TObjectGuard<TMemoryStream> Stream(new TMemoryStream);
  {
    TObjectGuard<TWriter> Writer(new TWriter(Stream.Get(), 1024));
    Writer->SetRoot(ARoot);
    for (int I = 0; ASelection && I < ASelection->GetCount(); ++I)
      if (auto* Component = dynamic_cast<TComponent*>(ASelection->Get(I))) {
        Writer->WriteSignature();
        Writer->WriteComponent(Component);
      }
    Writer->WriteValue(vaNull);
  } // freeing the writer flushes its buffer
  Module->CopyStreamToClipboard(Stream.Get());
}

void TDesignWindow::PasteComponents(TComponent* AOwner, TComponent* AParent,
                                    const IPtr<IDesignerSelections>& ASelection) {
  TObjectGuard<TMemoryStream> Stream(DesignRoot()->GetClipboardStream());
  TObjectGuard<TReader> Reader(new TReader(Stream.Get(), 1024));
  Reader->OnSetName = TSetNameEvent::Bind<&TDesignWindow::ReaderSetName>(this);
  FOwner = AOwner;
  FSelection = ASelection;
  auto Forget = Finally([this]() noexcept {
    FOwner = nullptr;
    FSelection = nullptr;
  });
  Reader->ReadComponents(AOwner, AParent, [this](TComponent* C) { ComponentRead(C); });
}

void TDesignWindow::ReaderSetName(TReader* AReader, TComponent* AComponent, String& AName) {
  if (AReader->Root() == FOwner && FOwner && FOwner->FindComponent(AName)) AName = UniqueName(AComponent);
}

void TDesignWindow::ComponentRead(TComponent* AComponent) {
  if (FSelection) FSelection->Add(AComponent);
}

//===----------------------------------------------------------------------===//
// Positions
//===----------------------------------------------------------------------===//

namespace {
/// The form that owns `F`, when `F` stands on its own (no parent) and moves with it.
TCustomForm* OwnerForm(const TCustomForm* F) {
  if (F->Parent()) return nullptr;
  return dynamic_cast<TForm*>(F->Owner());
}

int ToDefaultPPI(const TCustomForm* F, int Value) { return MulDiv(Value, DefaultPPI, F->CurrentPPI()); }

/// `Value` kept between 0 and `Room`, where `Room` may itself be below 0.
int ClampInto(int Value, int Room) { return std::max(std::min(Value, Room), 0); }
} // namespace

void SaveFormPos(TCustomIniFile* AIniFile, const String& ASection, TCustomForm* AForm) {
  TPoint Pos = AForm->BoundsRect().TopLeft();
  TMonitor* M = nullptr;
  if (TCustomForm* Owner = OwnerForm(AForm)) {
    TPoint Origin = Owner->ClientOrigin();
    Pos = {Pos.X - Origin.X, Pos.Y - Origin.Y};
  } else {
    M = Screen()->MonitorFromRect(AForm->BoundsRect(), mdNearest);
    if (M) Pos = {Pos.X - M->Left(), Pos.Y - M->Top()};
  }
  AIniFile->WriteInteger(ASection, "Left", ToDefaultPPI(AForm, Pos.X));
  AIniFile->WriteInteger(ASection, "Top", ToDefaultPPI(AForm, Pos.Y));
  AIniFile->WriteInteger(ASection, "Width", ToDefaultPPI(AForm, AForm->Width()));
  AIniFile->WriteInteger(ASection, "Height", ToDefaultPPI(AForm, AForm->Height()));
  if (M) AIniFile->WriteInteger(ASection, "MonitorIndex", M->MonitorNum());
  else AIniFile->DeleteKey(ASection, "MonitorIndex");
}

void LoadFormPos(TCustomIniFile* AIniFile, const String& ASection, TCustomForm* AForm) {
  int L = AForm->ScaleValue(AIniFile->ReadInteger(ASection, "Left", 0));
  int T = AForm->ScaleValue(AIniFile->ReadInteger(ASection, "Top", 0));
  int W = AForm->ScaleValue(AIniFile->ReadInteger(ASection, "Width", 0));
  int H = AForm->ScaleValue(AIniFile->ReadInteger(ASection, "Height", 0));
  int MonitorIndex = AIniFile->ReadInteger(ASection, "MonitorIndex", -1);
  TCustomForm* Owner = OwnerForm(AForm);
  if (Owner && (W < 1 || H < 1)) {
    W = AForm->Width();
    H = AForm->Height();
    L = (Owner->Width() - W) / 2;
    T = (Owner->Height() - H) / 2;
  }
  if (W < 2 || H < 2) return;
  TMonitor* M = nullptr;
  if (Owner) {
    TPoint Origin = Owner->ClientOrigin();
    L += Origin.X;
    T += Origin.Y;
    AForm->SetBounds(L, T, W, H);
    M = Screen()->MonitorFromRect(Owner->BoundsRect(), mdNearest);
    if (M) {
      L -= M->Left();
      T -= M->Top();
    }
  } else if (MonitorIndex < 0 || MonitorIndex >= Screen()->MonitorCount()) {
    M = Screen()->MonitorFromRect(AForm->BoundsRect(), mdNearest);
  } else {
    M = Screen()->Monitors(MonitorIndex);
  }
  if (M) {
    L = ClampInto(L, M->Width() - W) + M->Left();
    T = ClampInto(T, M->Height() - H) + M->Top();
  } else {
    L = ClampInto(L, Screen()->Width() - W);
    T = ClampInto(T, Screen()->Height() - H);
  }
  AForm->SetBounds(L, T, W, H);
}

} // namespace formkit
