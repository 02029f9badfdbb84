//===- frameworks/kiln/design/DMForm.cpp - The design window of a data module ===//
#include "frameworks/kiln/design/DMForm.h"

#include "core/Designers.h"
#include "platform/Rtti.h"
#include "platform/ScopeGuard.h"

#include <cstdint>

namespace formkit {

FK_IMPLEMENT(TComponentContainer, "DMForm") {}
FK_IMPLEMENT(TDataModuleForm, "DMForm") {}
FK_IMPLEMENT(TDataModuleCustomModule, "DMForm") {}
FK_IMPLEMENT(TDataModuleSelectionEditor, "DMForm") {}
FK_IMPLEMENT(TDataModuleClassGroupProperty, "DMForm") {}

TCreateDesignerFormProc DMForm::CreateDesignerFormProc;

namespace {
/// The stored window: where it stands and the size of its client area.
constexpr int StoredLeft = 8;
constexpr int StoredTop = 8;
constexpr int StoredClientWidth = 389;
constexpr int StoredClientHeight = 201;
/// The scroll bars keep this much space beyond the last icon.
constexpr int ContainerScrollMargin = 8;

/// The two signed 16-bit halves of a design position: left low, top high.
TPoint UnpackDesignInfo(std::int32_t Info) {
  auto Bits = static_cast<std::uint32_t>(Info);
  return {static_cast<std::int16_t>(Bits & 0xFFFFu), static_cast<std::int16_t>(Bits >> 16)};
}

std::int32_t PackDesignInfo(TPoint P) {
  auto Bits = (static_cast<std::uint32_t>(static_cast<std::uint16_t>(P.Y)) << 16) |
              static_cast<std::uint16_t>(P.X);
  return static_cast<std::int32_t>(Bits);
}
} // namespace

//===----------------------------------------------------------------------===//
// TComponentContainer
//===----------------------------------------------------------------------===//

void TComponentContainer::Create(TComponent* AOwner) {
  FCanvas.Reset(new TCanvas);
  inherited::Create(AOwner);
}

void TComponentContainer::BeforeDestruction() {
  inherited::BeforeDestruction();
  FCanvas.Reset();
}

TBrush* TComponentContainer::GetBrush() {
  FCanvas->Brush()->SetColor(GetBackgroundColor());
  return FCanvas->Brush();
}

void TComponentContainer::PaintWindow(TCanvas* Canvas) {
  Canvas->Brush()->SetColor(GetBackgroundColor());
  Canvas->FillRect(ClientRect());
}

void TComponentContainer::WndProc(TMessage& Message) {
  inherited::WndProc(Message);
  if (!FCanvas) return;
  if (Message.Msg == CM_COLORCHANGED) FCanvas->Brush()->SetColor(Color());
  else if (Message.Msg == CM_FONTCHANGED) FCanvas->Font()->Assign(Font());
}

//===----------------------------------------------------------------------===//
// TDataModuleForm
//===----------------------------------------------------------------------===//

TDataModuleForm* TDataModuleForm::CreateFor(TComponent* Root, const IPtr<IDesigner>& Designer) {
  auto* Form = CreateComponentOf<TDataModuleForm>(nullptr);
  auto Undo = OnFailure([&]() noexcept { Form->Destroy(); });
  Form->SetDesigning(true, false);
  Form->SetBounds(StoredLeft, StoredTop, Form->Width(), Form->Height());
  Form->SetClientWidth(StoredClientWidth);
  Form->SetClientHeight(StoredClientHeight);
  Form->FDataModule = Root;
  Form->FDesigner = Designer;
  RegisterDesignNotification(IPtr<IDesignNotification>(Form));

  auto* Container = CreateComponentOf<TComponentContainer>(Form);
  Container->SetParent(Form);
  for (TControlScrollBar* Bar : {Container->HorzScrollBar(), Container->VertScrollBar()}) {
    Bar->SetMargin(ContainerScrollMargin);
    Bar->SetTracking(true);
  }
  Container->SetAlign(alClient);
  Container->SetColor(clWindow);
  TControlStyle Style = Container->ControlStyle();
  Style.Include(csOpaque);
  Container->SetControlStyle(Style);
  Form->FComponentContainer = Container;

  Form->UpdateDesigner();
  if (Root) Form->InsertComponent(Root);
  return Form;
}

TPoint TDataModuleForm::StoredSize() {
  return {StoredClientWidth + 2 * FormFrameWidth, StoredClientHeight + FormCaptionHeight + 2 * FormFrameWidth};
}

void TDataModuleForm::BeforeDestruction() {
  RunIgnoringExceptions([this] { UnregisterDesignNotification(IPtr<IDesignNotification>(this)); });
  FDesigner = nullptr;
  FComponentContainer = nullptr;
  inherited::BeforeDestruction();
}

void TDataModuleForm::UpdateDesigner() {
  if (!FDesigner || !FDataModule || !FComponentContainer) return;
  FUpdating = true;
  auto Done = Finally([this]() noexcept { FUpdating = false; });
  SetCaption(FDataModule->Name());
  TPoint Position = UnpackDesignInfo(FDataModule->DesignInfo());
  TPoint Size, Offset;
  if (auto* Module = dynamic_cast<TDataModule*>(FDataModule)) {
    if (Module->DesignPPI() == 0) Module->SetDesignPPI(Screen()->PixelsPerInch());
    Size = Module->DesignSize();
    Offset = Module->DesignOffset();
  }
  SetBounds(Position.X, Position.Y, Size.X, Size.Y);
  TControlScrollBar* Horz = FComponentContainer->HorzScrollBar();
  TControlScrollBar* Vert = FComponentContainer->VertScrollBar();
  Horz->SetPosition(Offset.X);
  Vert->SetPosition(Offset.Y);
  TPoint Scrolled{Horz->Position(), Vert->Position()};
  TRect Ranges = FDesigner->GetScrollRanges(Scrolled);
  Horz->SetRange(Ranges.Right);
  Vert->SetRange(Ranges.Bottom);
}

void TDataModuleForm::SetBounds(int ALeft, int ATop, int AWidth, int AHeight) {
  inherited::SetBounds(ALeft, ATop, AWidth, AHeight);
  // A move is a resize too: the module keeps where its window stands.
  FormResize(this);
}

void TDataModuleForm::FormResize(TObject*) {
  if (!FDataModule || FUpdating) return;
  FDataModule->SetDesignInfo(PackDesignInfo({Left(), Top()}));
  auto* Module = dynamic_cast<TDataModule*>(FDataModule);
  if (!Module) return;
  Module->SetDesignSize({Width(), Height()});
  if (FComponentContainer)
    Module->SetDesignOffset({FComponentContainer->HorzScrollBar()->Position(), FComponentContainer->VertScrollBar()->Position()});
}

void TDataModuleForm::ScaleForPPI(int) {
  auto* Module = dynamic_cast<TDataModule*>(FDataModule);
  if (!Module) {
    inherited::ScaleForPPI(CurrentPPI());
    return;
  }
  int New = CurrentPPI();
  int Old = Module->DesignPPI();
  if (Old == New || Old <= 0 || Module->Name().empty()) return;
  TPoint Size = Module->DesignSize();
  Size = {MulDiv(Size.X, New, Old), MulDiv(Size.Y, New, Old)};
  Module->SetDesignSize(Size);
  SetBounds(Left(), Top(), Size.X, Size.Y);
  for (int I = 0; I < Module->ComponentCount(); ++I) {
    TComponent* C = Module->Components(I);
    TPoint P = UnpackDesignInfo(C->DesignInfo());
    C->SetDesignInfo(PackDesignInfo({MulDiv(P.X, New, Old), MulDiv(P.Y, New, Old)}));
  }
  Module->SetDesignPPI(New);
  if (IPtr<IDesignerNotify> Hook = GetDesigner()) Hook->Modified();
}

void TDataModuleForm::FocusContainer() {
  if (FComponentContainer) SetActiveControl(FComponentContainer);
}

void TDataModuleForm::ItemsModified(const IPtr<IDesigner>& ADesigner) {
  if (ADesigner == FDesigner) UpdateDesigner();
}

void TDataModuleForm::DesignerOpened(const IPtr<IDesigner>& ADesigner, bool) {
  if (ADesigner == FDesigner) UpdateDesigner();
}

void TDataModuleForm::DesignerClosed(const IPtr<IDesigner>& ADesigner, bool) {
  if (ADesigner == FDesigner) FDesigner = nullptr;
}

//===----------------------------------------------------------------------===//
// TDataModuleCustomModule
//===----------------------------------------------------------------------===//

TClass TDataModuleCustomModule::DesignClass() const { return TForm::StaticClass(); }

bool TDataModuleCustomModule::IsInvalidDataModuleClass(TClass AClass) {
  IPtr<IInternalComponentDesigners> All = Designers();
  if (!All || !AClass) return false;
  for (TClass Invalid : All->InvalidDataModuleClasses())
    if (Invalid && AClass->InheritsFrom(Invalid)) return true;
  return false;
}

bool TDataModuleCustomModule::ValidateComponentClass(TClass AClass) {
  return inherited::ValidateComponentClass(AClass) && !IsInvalidDataModuleClass(AClass);
}

TClass TDataModuleCustomModule::GetFinderClass() {
  auto Group = QueryAs<IModuleClassGroup>(Designer());
  if (!Group || !QueryAs<IRoot>(Designer())) return inherited::GetFinderClass();
  if (!Group->ClassGroupKnown()) return TControl::StaticClass();
  TClass Class = Group->GetClassGroupClass();
  return Class ? Class : inherited::GetFinderClass();
}

void TDataModuleCustomModule::CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root,
                                                 TCustomForm*& DesignForm, TWinControl*& ComponentContainer) {
  TDataModuleForm* Form = TDataModuleForm::CreateFor(Root, Designer);
  DesignForm = Form;
  ComponentContainer = Form->ComponentContainer();
}

void TDataModuleCustomModule::CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root,
                                                 IPtr<IHostForm>& DesignForm, TWinControl*& ComponentContainer) {
  DesignForm = nullptr;
  ComponentContainer = nullptr;
  if (DMForm::CreateDesignerFormProc) DMForm::CreateDesignerFormProc(Designer, Root, DesignForm, ComponentContainer);
}

//===----------------------------------------------------------------------===//
// The class group
//===----------------------------------------------------------------------===//

void TDataModuleSelectionEditor::FilterProperties(const IPtr<IDesignerSelections>& ASelection,
                                                  const IPtr<IInterfaceList>& AProperties) {
  if (!ASelection || ASelection->GetCount() != 1 || !dynamic_cast<TDataModule*>(ASelection->Get(0))) return;
  IPtr<TDataModuleClassGroupProperty> Property = New<TDataModuleClassGroupProperty>();
  Property->Create(Designer(), 1);
  AProperties->Add(IPtr<IInterface>(static_cast<IProperty*>(Property.Get())));
}

void TDataModuleClassGroupProperty::Create(const IPtr<IDesigner>& ADesigner, int APropCount) {
  inherited::Create(ADesigner, APropCount);
  FDesigner = ADesigner;
}

bool TDataModuleClassGroupProperty::GetEditValue(String& Value) {
  Value = GetValue();
  return true;
}

String TDataModuleClassGroupProperty::GetValue() {
  if (!QueryAs<IRoot>(FDesigner)) return String();
  auto Group = QueryAs<IModuleClassGroup>(FDesigner);
  return Group ? Group->GetClassGroupName() : String();
}

void TDataModuleClassGroupProperty::GetValues(const TGetStrProc& Proc) {
  Proc(TPersistent::StaticClass()->QualifiedClassName());
  if (IPtr<IInternalComponentDesigners> All = Designers())
    for (TClass Class : All->InvalidDataModuleClasses())
      if (Class) Proc(Class->QualifiedClassName());
}

void TDataModuleClassGroupProperty::SetValue(const String& Value) {
  auto Group = QueryAs<IModuleClassGroup>(FDesigner);
  if (!Group || !QueryAs<IRoot>(FDesigner)) return;
  CheckClassGroup(FDesigner->GetRoot(), Value);
  Group->SetClassGroupName(Value);
  FDesigner->Modified();
}

void CheckClassGroup(TComponent* Root, const String& QualifiedName) {
  PTypeInfo Type = TRttiContext().FindType(QualifiedName);
  if (!Type) throw EInvalidType(sUnableToFindType, QualifiedName);
  if (Type->Kind != tkClass) throw EInvalidType(sTypeMustBeClass, QualifiedName);
  TClass Class = GetTypeData(Type)->ClassRef;
  if (!Class->InheritsFrom(TPersistent::StaticClass())) throw EInvalidType(sTypeMustDescendFromPersistent, QualifiedName);
  TClass Group = ClassGroupOf(Class);
  TStringList Excluded;
  if (Root)
    for (int I = 0; I < Root->ComponentCount(); ++I) {
      TClass ComponentGroup = ClassGroupOf(Root->Components(I));
      if (ComponentGroup != TPersistent::StaticClass() && ComponentGroup != Group)
        Excluded.Add(Root->Components(I)->QualifiedClassName());
    }
  if (Excluded.Count() > 0) throw EInvalidType(sComponentsNotInClassGroup, Trim(Excluded.Text()));
}

} // namespace formkit
