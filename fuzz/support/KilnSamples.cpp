//===- fuzz/support/KilnSamples.cpp - Kiln modules for fuzzing ------------===//
#include "fuzz/support/KilnSamples.h"

#include "platform/ScopeGuard.h"

namespace formkit::fuzzing {

FK_IMPLEMENT(TSampleForm, "FuzzSamples") {
  B.Method<&TSampleForm::ButtonClick>("ButtonClick");
  B.Method<&TSampleForm::EditChange>("EditChange");
  B.Method<&TSampleForm::Tick>("Tick");
  B.Method<&TSampleForm::FormShow>("FormShow");
}

FK_IMPLEMENT(TSampleFrame, "FuzzSamples") { B.Method<&TSampleFrame::ButtonClick>("ButtonClick"); }

FK_IMPLEMENT(TSampleDataModule, "FuzzSamples") { B.Method<&TSampleDataModule::Tick>("Tick"); }

//===----------------------------------------------------------------------===//
// Link panels
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TLinkItem, "FuzzSamples") {
  B.Field("Caption", &TLinkItem::Caption);
  B.Property("Target", &TLinkItem::Target, &TLinkItem::SetTarget);
}

void TLinkItem::SetTarget(TComponent* Value) {
  FTarget = Value;
  if (auto* Panel = dynamic_cast<TLinkPanel*>(Collection() ? Collection()->GetOwner() : nullptr)) Panel->Watch(Value);
}

FK_IMPLEMENT(TLinkPanel, "FuzzSamples") {
  B.Property("Buddy", &TLinkPanel::Buddy, &TLinkPanel::SetBuddy);
  B.Field("Peer", &TLinkPanel::Peer);
  B.Property("Links", &TLinkPanel::Links);
}

void TLinkPanel::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FLinks = new TOwnedCollection(this, TLinkItem::StaticClass());
}

void TLinkPanel::BeforeDestruction() {
  FreeAndNil(FLinks);
  Peer = nullptr;
  inherited::BeforeDestruction();
}

void TLinkPanel::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove) return;
  if (FBuddy == AComponent) FBuddy = nullptr;
  if (!FLinks) return;
  for (int I = 0; I < FLinks->Count(); ++I) {
    auto* Item = static_cast<TLinkItem*>(FLinks->Items(I));
    if (Item->FTarget == AComponent) Item->FTarget = nullptr;
  }
}

void TLinkPanel::SetBuddy(TComponent* Value) {
  FBuddy = Value;
  Watch(Value);
}

void TLinkPanel::Watch(TComponent* Target) {
  if (Target) FreeNotification(Target);
}

TLinkItem* TLinkPanel::AddLink(const String& Caption, TComponent* Target) {
  auto* Item = static_cast<TLinkItem*>(FLinks->Add());
  Item->Caption = Caption;
  Item->SetTarget(Target);
  return Item;
}

//===----------------------------------------------------------------------===//
// Starting
//===----------------------------------------------------------------------===//

void StartKilnSamples() {
  static const bool Started = [] {
    InitializeKiln();
    RegisterClasses({TSampleForm::StaticClass(), TSampleFrame::StaticClass(), TSampleDataModule::StaticClass(),
                     TLinkPanel::StaticClass()});
    return true;
  }();
  (void)Started;
}

TComponent* NewSampleForm() { return CreateComponentOf<TSampleForm>(nullptr); }
TComponent* NewSampleFrame() { return CreateComponentOf<TSampleFrame>(nullptr); }
TComponent* NewSampleDataModule() { return CreateComponentOf<TSampleDataModule>(nullptr); }

//===----------------------------------------------------------------------===//
// Modules
//===----------------------------------------------------------------------===//

namespace {

/// A component of `T` owned by `Owner`, named `Name`, in `Parent` when it is a control.
template <class T> T* Make(TComponent* Owner, TWinControl* Parent, const String& Name) {
  T* C = CreateComponentOf<T>(Owner);
  C->SetName(Name);
  if constexpr (std::is_base_of_v<TControl, T>) C->SetParent(Parent);
  return C;
}

template <class T> T* Find(TComponent* Root, const char* Path) {
  auto* C = dynamic_cast<T*>(FindNestedComponent(Root, Path));
  if (!C) Finding("a sample module lacks a component it was built with");
  return C;
}

/// A new root of `T` named `Name`, freed again if building it fails.
template <class T, class F> T* BuildRoot(const char* Name, F Fill) {
  T* Root = CreateComponentOf<T>(nullptr);
  auto Free = OnFailure([&]() noexcept { Root->Destroy(); });
  Root->SetName(Name);
  Fill(Root);
  return Root;
}

void FillModuleA(TSampleForm* Form) {
  Form->SetCaption("Module A");
  Form->SetClientWidth(480);
  Form->SetClientHeight(300);
  Form->OnShow = TNotifyEvent::Bind<&TSampleForm::FormShow>(Form);
  auto* Panel = Make<TPanel>(Form, Form, "Panel1");
  Panel->SetBounds(8, 8, 240, 120);
  Panel->SetBevelOuter(bvLowered);
  Panel->SetCaption("");
  auto* B1 = Make<TButton>(Form, Panel, "Button1");
  B1->SetBounds(8, 8, 75, 25);
  B1->SetDefault(true);
  B1->OnClick = TNotifyEvent::Bind<&TSampleForm::ButtonClick>(Form);
  auto* B2 = Make<TButton>(Form, Panel, "Button2");
  B2->SetBounds(96, 8, 75, 25);
  B2->SetCaption("Cancel");
  B2->SetCancel(true);
  B2->SetModalResult(2);
  auto* Edit = Make<TEdit>(Form, Panel, "Edit1");
  Edit->SetBounds(8, 48, 160, 23);
  Edit->SetMaxLength(40);
  Edit->SetText("");
  Edit->OnChange = TNotifyEvent::Bind<&TSampleForm::EditChange>(Form);
  auto* Label = Make<TLabel>(Form, Form, "Label1");
  Label->SetBounds(260, 12, 65, 17);
  Label->SetCaption("Name:");
  Label->Font()->SetStyle({fsBold});
  Label->SetTransparent(true);
  auto* Check = Make<TCheckBox>(Form, Form, "CheckBox1");
  Check->SetBounds(260, 40, 97, 19);
  Check->SetAllowGrayed(true);
  Check->SetState(cbGrayed);
  Check->SetHint("Remember");
  auto* Timer = Make<TTimer>(Form, nullptr, "Timer1");
  Timer->SetInterval(250);
  Timer->OnTimer = TNotifyEvent::Bind<&TSampleForm::Tick>(Form);
  Timer->SetDesignInfo((200 << 16) | 300);
  auto* Links = Make<TLinkPanel>(Form, Form, "LinkPanel1");
  Links->SetBounds(8, 140, 240, 60);
  Links->SetAlign(alBottom);
  Links->SetBuddy(Edit);
  Links->AddLink("first", B1);
  Links->AddLink("timer", Timer);
  Links->AddLink("none", nullptr);
}

void FillModuleB(TSampleForm* Form, TComponent* A) {
  Form->SetCaption("Module B");
  Form->SetBorderStyle(bsDialog);
  Form->SetClientWidth(360);
  Form->SetClientHeight(200);
  auto* Outer = Make<TPanel>(Form, Form, "Panel1");
  Outer->SetAlign(alClient);
  Outer->SetBorderWidth(4);
  auto* Inner = Make<TPanel>(Form, Outer, "Panel2");
  Inner->SetAlign(alTop);
  Inner->SetBevelInner(bvRaised);
  auto* B1 = Make<TButton>(Form, Inner, "Button1");
  B1->SetBounds(4, 4, 75, 25);
  B1->OnClick = TNotifyEvent::Bind<&TSampleForm::ButtonClick>(Form);
  auto* Links = Make<TLinkPanel>(Form, Outer, "LinkPanel1");
  Links->SetAlign(alBottom);
  Links->SetBuddy(Find<TButton>(A, "Button1"));
  Links->Peer = IPtr<IInterface>(ComponentReference(Find<TEdit>(A, "Edit1")));
  Links->AddLink("panel", Find<TPanel>(A, "Panel1"));
  Links->AddLink("timer", Find<TTimer>(A, "Timer1"));
  Links->AddLink("own", B1);
  Links->AddLink("root", A);
  auto* Local = Make<TLinkPanel>(Form, Inner, "LinkPanel2");
  Local->SetBuddy(Links);
  Local->AddLink("back", Find<TLinkPanel>(A, "LinkPanel1"));
}

void FillAncestor(TSampleForm* Form) {
  Form->SetCaption("Main");
  Form->SetClientWidth(400);
  Form->SetClientHeight(250);
  auto* Panel = Make<TPanel>(Form, Form, "Panel1");
  Panel->SetBounds(8, 8, 200, 80);
  auto* B1 = Make<TButton>(Form, Panel, "Button1");
  B1->SetBounds(8, 8, 75, 25);
  B1->OnClick = TNotifyEvent::Bind<&TSampleForm::ButtonClick>(Form);
  auto* B2 = Make<TButton>(Form, Panel, "Button2");
  B2->SetBounds(96, 8, 75, 25);
  auto* Edit = Make<TEdit>(Form, Form, "Edit1");
  Edit->SetBounds(8, 96, 121, 23);
  Make<TLabel>(Form, Form, "Label1")->SetBounds(140, 100, 65, 17);
  Make<TTimer>(Form, nullptr, "Timer1")->SetDesignInfo((10 << 16) | 20);
  auto* Links = Make<TLinkPanel>(Form, Form, "LinkPanel1");
  Links->SetBounds(8, 130, 200, 60);
  Links->SetBuddy(B2);
  Links->AddLink("edit", Edit);
}

void EditDescendant(TSampleForm* Form) {
  auto* Panel = Find<TPanel>(Form, "Panel1");
  Find<TButton>(Form, "Button1")->SetLeft(20);
  Panel->SendToBack(Find<TButton>(Form, "Button2"));
  auto* B3 = Make<TButton>(Form, Panel, "Button3");
  B3->SetBounds(8, 40, 75, 25);
  B3->OnClick = TNotifyEvent::Bind<&TSampleForm::ButtonClick>(Form);
  // A new container, first in z-order, that took an inherited control and has one of its own.
  auto* Panel2 = Make<TPanel>(Form, Form, "Panel2");
  Panel2->SetBounds(220, 8, 160, 120);
  Find<TEdit>(Form, "Edit1")->SetParent(Panel2);
  Make<TCheckBox>(Form, Panel2, "CheckBox1")->SetChecked(true);
  Form->SendToBack(Panel2);
  auto* Links = Find<TLinkPanel>(Form, "LinkPanel1");
  Links->SetBuddy(Panel2);
  Links->AddLink("new", B3);
  Form->Font()->SetSize(11);
}

void FillFrame(TSampleFrame* Frame) {
  auto* B = Make<TButton>(Frame, Frame, "Button1");
  B->OnClick = TNotifyEvent::Bind<&TSampleFrame::ButtonClick>(Frame);
  Make<TEdit>(Frame, Frame, "Edit1")->SetTop(30);
  Make<TTimer>(Frame, nullptr, "Timer1")->SetEnabled(false);
}

void FillFormWithFrame(TSampleForm* Form) {
  Form->SetClientWidth(500);
  auto* Panel = Make<TPanel>(Form, Form, "Panel1");
  Panel->SetAlign(alClient);
  // An inline frame owns its components, so their names are its own.
  auto* Frame = CreateComponentOf<TSampleFrame>(Form);
  Frame->SetInline(true);
  Frame->SetName("Frame11");
  Frame->SetParent(Panel);
  Frame->SetBounds(10, 10, 300, 120);
  auto* B = Make<TButton>(Frame, Frame, "Button1");
  B->SetCaption("In a frame");
  B->OnClick = TNotifyEvent::Bind<&TSampleForm::ButtonClick>(Form);
  Make<TEdit>(Frame, Frame, "Edit1")->SetTop(40);
  Make<TButton>(Form, Form, "Button1")->SetTop(200);
}

void FillDataModule(TSampleDataModule* Module) {
  Module->SetDesignSize(Point(300, 200));
  Module->SetDesignOffset(Point(4, 8));
  Module->SetDesignPPI(96);
  Module->SetDesignInfo((10 << 16) | 5);
  auto* T1 = Make<TTimer>(Module, nullptr, "Timer1");
  T1->OnTimer = TNotifyEvent::Bind<&TSampleDataModule::Tick>(Module);
  T1->SetDesignInfo((24 << 16) | 48);
  auto* T2 = Make<TTimer>(Module, nullptr, "Timer2");
  T2->SetInterval(0);
  T2->SetEnabled(false);
}

} // namespace

TSampleForm* BuildModuleA() { return BuildRoot<TSampleForm>("ModuleA", FillModuleA); }

TSampleForm* BuildModuleB(TComponent* ModuleA) {
  return BuildRoot<TSampleForm>("ModuleB", [&](TSampleForm* Form) { FillModuleB(Form, ModuleA); });
}

TSampleForm* BuildAncestor() { return BuildRoot<TSampleForm>("Form1", FillAncestor); }

TSampleForm* NewDescendantRoot(const TBytes& AncestorData) {
  return static_cast<TSampleForm*>(ReadRoot(AncestorData, NewSampleForm));
}

TSampleForm* BuildDescendant(const TBytes& AncestorData) {
  TSampleForm* Form = NewDescendantRoot(AncestorData);
  auto Free = OnFailure([&]() noexcept { Form->Destroy(); });
  EditDescendant(Form);
  return Form;
}

TSampleFrame* BuildFrame() { return BuildRoot<TSampleFrame>("Frame1", FillFrame); }

TSampleForm* BuildFormWithFrame() { return BuildRoot<TSampleForm>("Form2", FillFormWithFrame); }

TSampleDataModule* BuildDataModule() { return BuildRoot<TSampleDataModule>("DataModule1", FillDataModule); }

} // namespace formkit::fuzzing
