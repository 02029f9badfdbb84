//===- frameworks/kiln/design/EditorFormDesigner.cpp - The frame in an editor page ===//
//
// The frame's construction and layout, the view actions on the active module,
// and the keys and focus handed to the designed form.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/EditorFormDesigner.h"

#include "core/ComponentDesignerIntf.h"
#include "core/DesignIntfClasses.h"
#include "platform/DeviceInfo.h"
#include "platform/ScopeGuard.h"

#include "frameworks/kiln/design/DMForm.h"

namespace formkit {

FK_IMPLEMENT(TEditorFormDesigner, "EditorFormDesigner") {}

TMessageTarget* ApplicationMessageTarget = nullptr;

std::intptr_t SendAppMessage(std::uint32_t Msg, std::intptr_t WParam, std::intptr_t LParam) {
  return ApplicationMessageTarget ? SendMessage(ApplicationMessageTarget, Msg, WParam, LParam) : 0;
}

namespace {
/// The height of the view selector on top of the frame.
constexpr int ViewSelectorHeight = 34;
/// The size of the picture above the question.
constexpr int PictureSize = 64;

bool IsKeyMessage(std::uint32_t Msg) {
  return (Msg >= WM_KEYDOWN && Msg <= WM_CHAR) || (Msg >= WM_SYSKEYDOWN && Msg <= WM_SYSCHAR);
}

/// The name under which `Master` lists `View`; empty when it does not.
/// Makes the master its own active view and shows it.
void ShowMaster(const IPtr<IRoot>& Master) {
  CastAs<IInternalRoot>(Master)->SetActiveView(Master);
  Master->Show();
}

String ViewNameOf(const IPtr<IRoot>& Master, const IPtr<IRoot>& View) {
  for (int I = 0, N = Master->GetViewCount(); I < N; ++I)
    if (Master->GetView(I).Get() == View.Get()) return Master->GetViewName(I);
  return "";
}
} // namespace

//===----------------------------------------------------------------------===//
// Construction and teardown
//===----------------------------------------------------------------------===//

void TEditorFormDesigner::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 700, 300);

  ViewSelector = CreateComponentOf<TViewSelectorFrame>(this);
  ViewSelector->SetParent(this);
  ViewSelector->SetAlign(alTop);
  ViewSelector->SetHeight(ViewSelectorHeight);

  VirtualImage1 = CreateComponentOf<TImage>(this);
  VirtualImage1->SetParent(this);
  VirtualImage1->SetBounds(0, 0, PictureSize, PictureSize);

  LbOpenDesigner = CreateComponentOf<TLabel>(this);
  LbOpenDesigner->SetParent(this);
  LbOpenDesigner->SetCaption(LoadResString(sDesignerInAnotherWindow));

  BtnOpenDesigner = CreateComponentOf<TButton>(this);
  BtnOpenDesigner->SetParent(this);
  BtnOpenDesigner->SetCaption("Move Designer");
  BtnOpenDesigner->SetBounds(0, 0, 130, 25);
  BtnOpenDesigner->OnClick = TNotifyEvent::Bind<&TEditorFormDesigner::BtnOpenDesignerClick>(this);

  ViewSelector->OnAddView = TViewNameEvent::Bind<&TEditorFormDesigner::DoAddView>(this);
  ViewSelector->OnRemoveView = TViewNameEvent::Bind<&TEditorFormDesigner::DoRemoveView>(this);
  ViewSelector->OnSelectView = TViewNameEvent::Bind<&TEditorFormDesigner::DoSelectView>(this);
  ViewSelector->OnSelectStyle = TViewStyleEvent::Bind<&TEditorFormDesigner::DoSelectStyle>(this);
  ViewSelector->OnCheckView = TViewCheckEvent::Bind<&TEditorFormDesigner::DoCheckView>(this);
  ViewSelector->OnRotateView = TNotifyEvent::Bind<&TEditorFormDesigner::DoRotateView>(this);
  ViewSelector->OnBackgroundView = TNotifyEvent::Bind<&TEditorFormDesigner::DoBackgroundView>(this);
  ViewSelector->SetVisible(false);

  RegisterDesignNotification(IPtr<IDesignNotification>(static_cast<IDesignNotificationViews*>(this)));
  FNotificationRegistered = true;
  FrameAlignPosition(Rect(0, ViewSelectorHeight, Width(), Height()));
}

void TEditorFormDesigner::BeforeDestruction() {
  if (std::exchange(FNotificationRegistered, false))
    RunIgnoringExceptions([this] {
      UnregisterDesignNotification(IPtr<IDesignNotification>(static_cast<IDesignNotificationViews*>(this)));
    });
  SetFocusedControl(nullptr);
  FActiveDesigner = nullptr;
  inherited::BeforeDestruction();
}

void TEditorFormDesigner::FrameAlignPosition(const TRect& R) {
  int Gap4 = ScaleValue(4), Gap12 = ScaleValue(12);
  int Total = VirtualImage1->Height() + Gap4 + LbOpenDesigner->Height() + Gap12 + BtnOpenDesigner->Height();
  int Top = R.Top + (R.Height() - Total) / 2;
  auto Centre = [&](TControl* Control, int ControlTop) {
    Control->SetBounds(R.Left + (R.Width() - Control->Width()) / 2, ControlTop, Control->Width(), Control->Height());
  };
  Centre(VirtualImage1, Top);
  Centre(LbOpenDesigner, Top + VirtualImage1->Height() + Gap4);
  Centre(BtnOpenDesigner, Top + VirtualImage1->Height() + Gap4 + LbOpenDesigner->Height() + Gap12);
}

void TEditorFormDesigner::BtnOpenDesignerClick(TObject*) {
  for (TWinControl* P = Parent(); P; P = P->Parent())
    if (auto* Form = dynamic_cast<TCustomForm*>(P)) {
      PostMessage(Form, UM_OPENDESIGNER, 0, 0);
      return;
    }
}

//===----------------------------------------------------------------------===//
// The active designer and its views
//===----------------------------------------------------------------------===//

IPtr<IRoot> TEditorFormDesigner::ActiveRoot() const { return QueryAs<IRoot>(FActiveDesigner); }

void TEditorFormDesigner::SetActiveDesigner(const IPtr<IDesigner>& Designer) {
  IPtr<IRoot> Root = QueryAs<IRoot>(Designer);
  if (!Root) return;
  if (Root.Get() != ActiveRoot().Get()) {
    if (IPtr<IRoot> Master = Root->GetMasterView()) {
      SetActiveDesigner(Master->GetDesigner());
      return;
    }
    FActiveDesigner = Designer;
    UpdateViewSelector();
  }
  HighlightActiveView();
}

void TEditorFormDesigner::HighlightActiveView() {
  String Name;
  if (IPtr<IRoot> Root = ActiveRoot())
    if (IPtr<IRoot> Active = Root->GetActiveView(); Active && Active.Get() != Root.Get())
      Name = ViewNameOf(Root, Active);
  if (!Name.empty()) ViewSelector->HighlightView(Name);
  else ViewSelector->HighlightView(0);
}

void TEditorFormDesigner::UpdateViewSelector() {
  TObjectGuard<TStringList> Views(new TStringList);
  if (IPtr<IRoot> Root = ActiveRoot())
    for (int I = 0, N = Root->GetViewCount(); I < N; ++I) Views->Add(Root->GetViewName(I));
  ViewSelector->PopulateViewSelector(Views.Get());
}

void TEditorFormDesigner::SelectPreviewStyle(TOTAOSFamily Family) {
  ViewSelector->PopulateStyleSelector();
  ViewSelector->SelectStyle(Family);
}

void TEditorFormDesigner::ViewAdded(const IPtr<IDesigner>&, const String&) { UpdateViewSelector(); }

void TEditorFormDesigner::ViewRemoved(const IPtr<IDesigner>&, const String&) { UpdateViewSelector(); }

void TEditorFormDesigner::DoCheckView(TObject*, const String& Name, bool& Allowed) {
  IPtr<IRoot> Root = ActiveRoot();
  Allowed = Name.empty() || (Root && Root->GetViewIndex(Name) >= 0);
}

void TEditorFormDesigner::DoSelectView(TObject*, const String& Name) {
  IPtr<IRoot> Root = ActiveRoot();
  if (!Root) return;
  if (Name.empty()) {
    ShowMaster(Root);
    return;
  }
  int Index = Root->GetViewIndex(Name);
  if (Index < 0) Index = Root->AddView(Name);
  Root->GetView(Index)->Show();
}

void TEditorFormDesigner::DoAddView(TObject*, const String& Name) {
  IPtr<IRoot> Root = ActiveRoot();
  if (!Root) return;
  Root->GetView(Root->AddView(Name))->Show();
  UpdateViewSelector();
}

void TEditorFormDesigner::DoRemoveView(TObject*, const String& Name) {
  IPtr<IRoot> Root = ActiveRoot();
  if (!Root) return;
  ShowMaster(Root);
  Root->RemoveView(Name);
  UpdateViewSelector();
  ViewSelector->SelectView(0);
}

IPtr<IViewDesignSupport> TEditorFormDesigner::FindViewSupport() const {
  IPtr<IRoot> Root = ActiveRoot();
  IPtr<IRoot> Active = Root ? Root->GetActiveView() : nullptr;
  for (TComponent* C = Active ? Active->GetRoot() : nullptr; C; C = C->GetParentComponent())
    if (IPtr<IViewDesignSupport> Support = InterfaceOf<IViewDesignSupport>(C)) return Support;
  return nullptr;
}

void TEditorFormDesigner::DoRotateView(TObject*) {
  if (IPtr<IViewDesignSupport> Support = FindViewSupport()) Support->RotateView();
}

void TEditorFormDesigner::DoBackgroundView(TObject*) {
  if (IPtr<IViewDesignSupport> Support = FindViewSupport()) Support->ToggleBackground();
}

void TEditorFormDesigner::DoSelectStyle(TObject*, TOTAOSFamily Family) {
  if (IPtr<IViewDesignSupport> Support = FindViewSupport()) Support->SelectStyle(Family);
  if (!FActiveDesigner) return;
  // Selecting the one object again makes the inspector show what the style changed.
  IPtr<IDesignerSelections> Selection = New<TDesignerSelections>();
  FActiveDesigner->GetSelections(Selection);
  if (Selection->GetCount() == 1) FActiveDesigner->SetSelections(Selection);
}

void TEditorFormDesigner::PackageNotification(const String&, TPackageNotifyOperation Operation) {
  IPtr<IRoot> Root = ActiveRoot();
  if (!Root) return;
  switch (Operation) {
  case poInstalled:
    UpdateViewSelector();
    HighlightActiveView();
    break;
  case poUninstalled: {
    bool Removed = false;
    for (int I = Root->GetViewCount(); I-- > 0;) {
      String Name = Root->GetViewName(I);
      if (TDeviceInfo::GetDeviceByID(Name)) continue;
      ShowMaster(Root);
      Root->RemoveView(Name);
      Removed = true;
    }
    UpdateViewSelector();
    if (Removed) ViewSelector->HighlightView(0);
    break;
  }
  case poUninstalling: break;
  }
}

//===----------------------------------------------------------------------===//
// Focus and keys
//===----------------------------------------------------------------------===//

void TEditorFormDesigner::SetFocusedControl(TWinControl* Control) {
  if (Control == FFocusedControl) return;
  if (FFocusedControl) FFocusedControl->RemoveFreeNotification(this);
  FFocusedControl = Control;
  if (!Control) return;
  Control->FreeNotification(this);
  SetColor(clWindow);
}

void TEditorFormDesigner::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FFocusedControl) FFocusedControl = nullptr;
}

bool TEditorFormDesigner::DispatchToDesigner(TMessage& Message) {
  auto* Form = dynamic_cast<TCustomForm*>(FFocusedControl);
  IPtr<IDesignerHook> Hook = Form ? QueryAs<IDesignerHook>(Form->GetDesigner()) : nullptr;
  return Hook && Hook->IsDesignMsg(Form, Message);
}

void TEditorFormDesigner::WndProc(TMessage& Message) {
  switch (Message.Msg) {
  case WM_GETDLGCODE: Message.Result = DLGC_WANTALL; return;
  case CN_SYSKEYDOWN:
    if (std::intptr_t Answer = SendAppMessage(CM_APPSYSKEYDOWN, Message.WParam, Message.LParam)) {
      Message.Result = Answer;
      return;
    }
    break;
  default: break;
  }
  auto* Form = dynamic_cast<TCustomForm*>(FFocusedControl);
  if (Form && Form->GetDesigner()) {
    if (IsKeyMessage(Message.Msg) && DispatchToDesigner(Message)) return;
    if (Message.Msg == CM_EDITORACTIVATE || Message.Msg == CM_EDITORDEACTIVATE) return;
    if (Message.Msg == CM_EDITORFOCUS && !ViewSelector->cbDeviceSelector->Clicking()) {
      if (IPtr<IInternalComponentContainerParent> Parent = InterfaceOf<IInternalComponentContainerParent>(Form))
        Parent->FocusContainer();
      else SetFocus(Form);
    }
  }
  inherited::WndProc(Message);
}

} // namespace formkit
