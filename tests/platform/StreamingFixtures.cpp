//===- tests/platform/StreamingFixtures.cpp - Trees for streaming tests ---===//
#include "tests/platform/StreamingFixtures.h"

#include <algorithm>

namespace formkit::streamtest {

FK_IMPLEMENT(TLook, "StreamTest") {
  B.Field("Size", &TLook::Size).Default(8);
  B.Field("Face", &TLook::Face);
}

FK_IMPLEMENT(TRow, "StreamTest") {
  B.Field("Caption", &TRow::Caption);
  B.Field("Width", &TRow::Width).Default(0);
  B.Field("Link", &TRow::Link);
}

FK_IMPLEMENT(TTestControl, "StreamTest") {
  B.Field("Left", &TTestControl::Left).Default(0);
  B.Field("Top", &TTestControl::Top).Default(0);
  B.Field("Width", &TTestControl::Width).Default(100);
  B.Field("Small", &TTestControl::Small).Default(0);
  B.Field("Letter", &TTestControl::Letter).Default('a');
  B.Field("Key", &TTestControl::Key).Default(0);
  B.Field("Tone", &TTestControl::Tone).Default(toMid);
  B.Field("Tones", &TTestControl::Tones).Default(TTones{});
  B.Field("Enabled", &TTestControl::Enabled).Default(true);
  B.Field("Ratio", &TTestControl::Ratio);
  B.Field("Scale", &TTestControl::Scale);
  B.Field("Caption", &TTestControl::Caption);
  B.Field("Hint", &TTestControl::Hint);
  B.Field("Big", &TTestControl::Big);
  B.Field("Buddy", &TTestControl::Buddy);
  B.Field("Value", &TTestControl::Value);
  B.Field("Peer", &TTestControl::Peer);
  B.Event("OnPoke", &TTestControl::OnPoke);
  B.Property("Look", &TTestControl::Look);
  B.Property("Rows", &TTestControl::Rows);
  B.Method<&TTestControl::Poke>("Poke");
}

void TTestControl::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  Look = new TLook;
  Rows = new TOwnedCollection(this, TRow::StaticClass());
}

void TTestControl::BeforeDestruction() {
  SetParentComponent(nullptr);
  for (TTestControl* C : FControls) C->FParent = nullptr;
  FControls.clear();
  FreeAndNil(Look);
  FreeAndNil(Rows);
  inherited::BeforeDestruction();
}

void TTestControl::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove) return;
  if (Buddy == AComponent) Buddy = nullptr;
  if (Rows)
    for (int I = 0; I < Rows->Count(); ++I) {
      auto* R = static_cast<TRow*>(Rows->Items(I));
      if (R->Link == AComponent) R->Link = nullptr;
    }
}

void TTestControl::SetParentComponent(TComponent* AParent) {
  auto* P = dynamic_cast<TTestControl*>(AParent);
  if (P == FParent) return;
  if (FParent) std::erase(FParent->FControls, this);
  FParent = P;
  if (P) P->FControls.push_back(this);
}

void TTestControl::GetChildren(const TGetChildProc& Proc, TComponent* Root) {
  for (TTestControl* C : std::vector<TTestControl*>(FControls))
    if (C->Owner() == Root) Proc(C);
}

void TTestControl::SetChildOrder(TComponent* Child, int Order) {
  auto It = std::find(FControls.begin(), FControls.end(), Child);
  if (It == FControls.end()) return;
  auto* C = *It;
  FControls.erase(It);
  Order = std::clamp(Order, 0, static_cast<int>(FControls.size()));
  FControls.insert(FControls.begin() + Order, C);
}

void TTestControl::DefineProperties(TFiler* Filer) {
  inherited::DefineProperties(Filer);
  auto* Anc = dynamic_cast<TTestControl*>(Filer->Ancestor());
  bool HasData = Anc ? Anc->Blob != Blob : !Blob.empty();
  Filer->DefineBinaryProperty(
      "Blob",
      [this](TStream* S) {
        Blob.resize(static_cast<std::size_t>(S->Size()));
        S->ReadBuffer(Blob.data(), S->Size());
      },
      [this](TStream* S) { S->WriteBuffer(Blob.data(), static_cast<std::int64_t>(Blob.size())); }, HasData);
}

void TTestControl::Loaded() {
  inherited::Loaded();
  ++LoadedCalls;
}

FK_IMPLEMENT(TTestForm, "StreamTest") { B.Method<&TTestForm::FormPoke>("FormPoke"); }

void TTestForm::GetChildren(const TGetChildProc& Proc, TComponent* Root) {
  inherited::GetChildren(Proc, Root);
  for (int I = 0; I < ComponentCount(); ++I) {
    TComponent* C = Components(I);
    auto* Ctl = dynamic_cast<TTestControl*>(C);
    if (!Ctl || !Ctl->FParent) Proc(C);
  }
}

void TTestForm::SetChildOrder(TComponent* Child, int Order) {
  auto* Ctl = dynamic_cast<TTestControl*>(Child);
  if (Ctl && Ctl->FParent == this) inherited::SetChildOrder(Child, Order);
  else Child->SetComponentIndex(Order);
}

FK_IMPLEMENT(TOtherForm, "StreamTest") {}

FK_IMPLEMENT(TTicker, "StreamTest") { B.Field("Interval", &TTicker::Interval).Default(1000); }

FK_IMPLEMENT(THidden, "StreamTest") {}

void RegisterStreamingClasses() {
  RegisterClasses({TTestControl::StaticClass(), TTestForm::StaticClass(), TOtherForm::StaticClass(),
                   TTicker::StaticClass()});
}

TTestControl* AddControl(TComponent* Owner, TTestControl* Parent, const String& Name, TClass Class) {
  auto* C = static_cast<TTestControl*>(CreateComponent(Class, Owner));
  C->SetName(Name);
  C->SetParentComponent(Parent);
  return C;
}

TTestForm* BuildRichForm() {
  RegisterStreamingClasses();
  auto* Form = static_cast<TTestForm*>(CreateComponent(TTestForm::StaticClass(), nullptr));
  Form->SetName("Form1");
  Form->Caption = "Main \"window\"\n\xC3\xA9t\xC3\xA9";
  Form->Width = 640;
  Form->Big = 5000000000LL;
  Form->Ratio = 1.25;
  Form->Scale = 0.5f;
  Form->Tones = TTones{toLow, toHigh};
  Form->Look->Size = 12;
  Form->Look->Face = "Sans";
  Form->Blob = {0x00, 0x01, 0xFE, 0xFF};
  Form->Value = TVariant(std::int64_t(7));
  TTestControl* Panel = AddControl(Form, Form, "Panel1");
  Panel->Left = 8;
  Panel->Top = -4;
  Panel->Tone = toHigh;
  Panel->Enabled = false;
  Panel->Hint = u"h\u00e9";
  TTestControl* B1 = AddControl(Form, Panel, "Button1");
  B1->Caption = String(300, 'x');
  B1->Small = -7;
  B1->Letter = 'z';
  B1->Key = u'\u20ac';
  B1->Value = TVariant::Null();
  B1->OnPoke = TPokeEvent::Bind<&TTestControl::Poke>(Form);
  TTestControl* B2 = AddControl(Form, Panel, "Button2");
  B2->Value = TVariant("text");
  B1->Buddy = B2; // a reference to a component read later
  B2->Peer = ComponentReference(Panel);
  auto* Ticker = static_cast<TTicker*>(CreateComponent(TTicker::StaticClass(), Form));
  Ticker->SetName("Ticker1");
  Ticker->Interval = 250;
  Ticker->SetDesignInfo((16 << 16) | 40);
  auto* R1 = static_cast<TRow*>(Form->Rows->Add());
  R1->Caption = "first";
  R1->Width = 30;
  R1->Link = Ticker;
  static_cast<TRow*>(Form->Rows->Add())->Caption = "second";
  Form->Buddy = Form; // the root itself
  return Form;
}

std::vector<std::uint8_t> BytesOf(TMemoryStream* S) {
  return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
}

std::vector<std::uint8_t> WriteBytes(TComponent* Root, TComponent* Ancestor) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, Ancestor);
    W->FlushBuffer();
  }
  return BytesOf(S.Get());
}

TComponent* ReadBytes(const std::vector<std::uint8_t>& Bytes, TComponent* Root) {
  RegisterStreamingClasses();
  TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(S.Get(), 4096));
  bool Own = Root == nullptr;
  if (Own) Root = CreateComponent(TTestForm::StaticClass(), nullptr);
  try {
    R->ReadRootComponent(Root);
  } catch (...) {
    if (Own) Root->Destroy();
    throw;
  }
  return Root;
}

String BinaryToText(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectBinaryToText(In.Get(), Out.Get());
  return String(reinterpret_cast<const char*>(Out->Memory()), static_cast<std::size_t>(Out->Size()));
}

std::vector<std::uint8_t> TextToBinary(const String& Text) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Text.data(), Text.size()));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectTextToBinary(In.Get(), Out.Get());
  return BytesOf(Out.Get());
}

} // namespace formkit::streamtest
