//===- frameworks/kiln/design/WCtlForm.cpp - The window around a control module ===//
#include "frameworks/kiln/design/WCtlForm.h"

#include "platform/ScopeGuard.h"

namespace formkit {

FK_IMPLEMENT(TWinControlForm, "WCtlForm") {}
FK_IMPLEMENT(TWinControlCustomModule, "WCtlForm") {}

TCreateDesignerFormProc WCtlForm::CreateDesignerFormProc;

namespace {
/// The stored window.
constexpr int StoredLeft = 8;
constexpr int StoredTop = 8;
constexpr int StoredClientWidth = 435;
constexpr int StoredClientHeight = 266;
constexpr int StoredTag = 93;
/// A handle as stored, and as placed at the control's edges.
constexpr int StoredHandleSize = 9;
constexpr int PlacedHandleSize = 5;

struct THandleSpec {
  const char* Name;
  int Top;
  int Tag;
  TCursor Cursor;
};
constexpr THandleSpec HandleSpecs[] = {
    {"WidthHandle", 8, SizerWidthBit, crSizeWE},
    {"SizeHandle", 24, SizerWidthBit | SizerHeightBit, crSizeNWSE},
    {"HeightHandle", 40, SizerHeightBit, crSizeNS},
};
constexpr int HandleLeft = 36;
} // namespace

TWinControlForm* TWinControlForm::CreateFor(const IPtr<IDesigner>& Designer, bool Sizing) {
  auto* Form = CreateComponentOf<TWinControlForm>(nullptr);
  auto Undo = OnFailure([&]() noexcept { Form->Destroy(); });
  Form->SetBounds(StoredLeft, StoredTop, Form->Width(), Form->Height());
  Form->SetClientWidth(StoredClientWidth);
  Form->SetClientHeight(StoredClientHeight);
  Form->SetTag(StoredTag);
  TShape** Fields[] = {&Form->FWidthHandle, &Form->FSizeHandle, &Form->FHeightHandle};
  for (std::size_t I = 0; I < std::size(HandleSpecs); ++I) {
    const THandleSpec& Spec = HandleSpecs[I];
    auto* Shape = CreateComponentOf<TShape>(Form);
    Shape->SetName(Spec.Name);
    Shape->SetParent(Form);
    Shape->SetBounds(HandleLeft, Spec.Top, StoredHandleSize, StoredHandleSize);
    Shape->SetTag(Spec.Tag);
    Shape->SetCursor(Spec.Cursor);
    Shape->Brush()->SetColor(clBlack);
    Shape->OnMouseDown = TMouseEvent::Bind<&TWinControlForm::SizerMouseDown>(Form);
    Shape->OnMouseMove = TMouseMoveEvent::Bind<&TWinControlForm::SizerMouseMove>(Form);
    Shape->OnMouseUp = TMouseEvent::Bind<&TWinControlForm::SizerMouseUp>(Form);
    *Fields[I] = Shape;
  }
  Form->FDesigner = Designer;
  RegisterDesignNotification(IPtr<IDesignNotification>(Form));
  Form->FSizing = Sizing;
  return Form;
}

void TWinControlForm::AfterConstruction() {
  inherited::AfterConstruction();
  SetDesigning(true, false);
}

void TWinControlForm::BeforeDestruction() {
  RunIgnoringExceptions([this] { UnregisterDesignNotification(IPtr<IDesignNotification>(this)); });
  FDesigner = nullptr;
  FControl = nullptr;
  FSizers = {};
  inherited::BeforeDestruction();
}

void TWinControlForm::Initialize(TWinControl* Control, bool Sizing) {
  FFollowingControl = true;
  auto Done = Finally([this]() noexcept { FFollowingControl = false; });
  FSizing = Sizing;
  HorzScrollBar()->SetVisible(Sizing);
  VertScrollBar()->SetVisible(Sizing);
  FControl = Control;
  SetBounds(0, 0, Control->Width(), Control->Height());
  Control->SetParent(this);
  for (int I = 0; I < ControlCount(); ++I) {
    auto* Shape = dynamic_cast<TShape*>(Controls(I));
    if (!Shape || Shape->Tag() < 1 || Shape->Tag() > 3) continue;
    FSizers[static_cast<std::size_t>(Shape->Tag() - 1)] = Shape;
    Shape->SetVisible(Sizing);
    Shape->SetDesigning(false, false);
  }
  Modified();
  // The window's own designer must not hear of the control as one of its components.
  IPtr<IDesignerNotify> Hook = GetDesigner();
  SetDesigner(nullptr);
  auto Restore = Finally([&]() noexcept { SetDesigner(Hook.Get()); });
  InsertComponent(Control);
}

void TWinControlForm::Modified() {
  if (!FControl) return;
  bool Outer = FFollowingControl;
  FFollowingControl = true;
  auto Done = Finally([this, Outer]() noexcept { FFollowingControl = Outer; });
  if (!FSizing) {
    FControl->SetBounds(0, 0, FControl->Width(), FControl->Height());
    int NewWidth = Width() - ClientWidth() + FControl->Width();
    int NewHeight = Height() - ClientHeight() + FControl->Height();
    SetBounds(Left(), Top(), NewWidth, NewHeight);
  } else {
    UpdateSizers();
  }
  SetCaption(FControl->Name());
}

void TWinControlForm::Resized() {
  inherited::Resized();
  FormResize(this);
}

void TWinControlForm::FormResize(TObject*) {
  if (FControl && !FSizing && !FFollowingControl) FControl->SetBounds(FControl->Left(), FControl->Top(), ClientWidth(), ClientHeight());
}

void TWinControlForm::UpdateSizers() {
  for (int Tag = 1; Tag <= 3; ++Tag) {
    TShape* Shape = Sizer(Tag);
    if (!Shape) continue;
    if (!FSizing || !FControl) {
      Shape->SetVisible(false);
      continue;
    }
    int X = FControl->Left() + ((Tag & SizerWidthBit) ? FControl->Width() : 0);
    int Y = FControl->Top() + ((Tag & SizerHeightBit) ? FControl->Height() : 0);
    Shape->SetVisible(true);
    Shape->SetDesigning(false, false);
    Shape->SetBounds(X, Y, PlacedHandleSize, PlacedHandleSize);
  }
}

//===----------------------------------------------------------------------===//
// Dragging a handle
//===----------------------------------------------------------------------===//

void TWinControlForm::DragStart(int Tag, int X, int Y) {
  FDragTag = Tag;
  FStartPoint = {X, Y};
  FStartSize = FControl ? TPoint{FControl->Width(), FControl->Height()} : TPoint{};
  DisableAutoRange();
}

void TWinControlForm::DragMove(int X, int Y) {
  if (FDragTag == 0 || !FControl) return;
  int NewWidth = FStartSize.X + ((FDragTag & SizerWidthBit) ? X - FStartPoint.X : 0);
  int NewHeight = FStartSize.Y + ((FDragTag & SizerHeightBit) ? Y - FStartPoint.Y : 0);
  FControl->SetBounds(FControl->Left(), FControl->Top(), NewWidth, NewHeight);
  UpdateSizers();
}

void TWinControlForm::DragEnd() {
  if (FDragTag == 0) return;
  FDragTag = 0;
  EnableAutoRange();
}

TPoint TWinControlForm::FormPoint(TObject* Sender, int X, int Y) const {
  auto* Shape = dynamic_cast<TControl*>(Sender);
  if (!Shape) return {X, Y};
  return ScreenToClient(Shape->ClientToScreen({X, Y}));
}

void TWinControlForm::SizerMouseDown(TObject* Sender, TMouseButton, TShiftState, int X, int Y) {
  auto* Shape = dynamic_cast<TComponent*>(Sender);
  TPoint P = FormPoint(Sender, X, Y);
  if (Shape) DragStart(Shape->Tag(), P.X, P.Y);
}

void TWinControlForm::SizerMouseMove(TObject* Sender, TShiftState, int X, int Y) {
  TPoint P = FormPoint(Sender, X, Y);
  DragMove(P.X, P.Y);
}

void TWinControlForm::SizerMouseUp(TObject*, TMouseButton, TShiftState, int, int) { DragEnd(); }

void TWinControlForm::FocusContainer() {
  if (FControl) SetActiveControl(FControl);
}

void TWinControlForm::ItemsModified(const IPtr<IDesigner>&) { Modified(); }

void TWinControlForm::DesignerOpened(const IPtr<IDesigner>& ADesigner, bool) {
  if (ADesigner != FDesigner) return;
  if (auto* Control = dynamic_cast<TWinControl*>(ADesigner->GetRoot())) Initialize(Control, FSizing);
}

//===----------------------------------------------------------------------===//
// TWinControlCustomModule
//===----------------------------------------------------------------------===//

void TWinControlCustomModule::CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root,
                                                 TCustomForm*& DesignForm, TWinControl*& ComponentContainer) {
  TWinControlForm* Form = TWinControlForm::CreateFor(Designer, GetAttributes().Contains(cmaVirtualSize));
  auto* Control = dynamic_cast<TWinControl*>(Root);
  if (Control) Control->SetParent(Form);
  DesignForm = Form;
  ComponentContainer = Control;
}

void TWinControlCustomModule::CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root,
                                                 IPtr<IHostForm>& DesignForm, TWinControl*& ComponentContainer) {
  DesignForm = nullptr;
  ComponentContainer = nullptr;
  if (WCtlForm::CreateDesignerFormProc) WCtlForm::CreateDesignerFormProc(Designer, Root, DesignForm, ComponentContainer);
}

} // namespace formkit
