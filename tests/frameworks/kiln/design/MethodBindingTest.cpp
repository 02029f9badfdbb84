//===- tests/frameworks/kiln/design/MethodBindingTest.cpp - Handlers, the host's source and pastes ===//
#include "platform/Filer.h"
#include "tests/frameworks/kiln/design/NamesFixture.h"

#include <algorithm>

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A style object below a component, with an event of its own.
class THeaderStyle : public TPersistent {
  FK_CLASS(THeaderStyle, TPersistent)
  TNotifyEvent OnChange;
};

class TColumn : public TCollectionItem {
  FK_CLASS(TColumn, TCollectionItem)
  TNotifyEvent OnClick;
};

/// A non-visual component with everything that may lie below one: a sub-component, a
/// collection, an empty and a filled style, and a plain reference.
class TColumnSource : public TComponent {
  FK_CLASS(TColumnSource, TComponent)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    FColumns = new TOwnedCollection(this, TColumn::StaticClass());
    FHeader = new THeaderStyle;
    FClock = CreateComponentOf<TTimer>(this);
    FClock->ChangeName("Clock");
    TComponentStyle Style = FClock->ComponentStyle();
    Style.Include(csSubComponent);
    FClock->SetComponentStyle(Style);
  }
  void BeforeDestruction() override {
    FreeAndNil(FColumns);
    FreeAndNil(FHeader);
    inherited::BeforeDestruction();
  }
  TComponent* FBuddy = nullptr;
  TTimer* FClock = nullptr;
  TOwnedCollection* FColumns = nullptr;
  THeaderStyle* FFooter = nullptr;
  THeaderStyle* FHeader = nullptr;
  TNotifyEvent FOnChange;
  TNotifyEvent FOnStart;
};

std::vector<String> OwnMethods(const IPtr<IRoot>& Root) { return fakes::OwnMethods(Root->GetRoot()); }

bool HasTemporaryMethod(const IPtr<IRoot>& Root) {
  std::vector<String> Names = OwnMethods(Root);
  return std::any_of(Names.begin(), Names.end(), [](const String& N) { return !N.empty() && N[0] == '@'; });
}

} // namespace

FK_IMPLEMENT(THeaderStyle, "Tests") { B.Event("OnChange", &THeaderStyle::OnChange); }
FK_IMPLEMENT(TColumn, "Tests") { B.Event("OnClick", &TColumn::OnClick); }
FK_IMPLEMENT(TColumnSource, "Tests") {
  B.Property("Buddy", &TColumnSource::FBuddy);
  B.Property("Clock", &TColumnSource::FClock);
  B.Property("Columns", &TColumnSource::FColumns);
  B.Property("Footer", &TColumnSource::FFooter);
  B.Property("Header", &TColumnSource::FHeader);
  B.Event("OnStart", &TColumnSource::FOnStart);
  B.Event("OnChange", &TColumnSource::FOnChange);
}

//===----------------------------------------------------------------------===//
// Handlers and the host's source
//===----------------------------------------------------------------------===//

TEST_F(NamesFixture, AHandlerIsAMethodOfTheModulesClassAndTextInTheSource) {
  IPtr<TRecordingModule> Module;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module);
  TKilnRoot* Kiln = KilnRoot(Form1);
  IPtr<IDesigner> Designer1 = QueryAs<IDesigner>(Form1);
  TButton* Button = Add<TButton>(Form1);
  Log.Clear();

  TMethod Click = Designer1->CreateMethod("Button1Click", NotifyEvent());
  EXPECT_EQ(Click.Code, reinterpret_cast<void*>(1)); // the first token: never called
  EXPECT_EQ(Click.Data, static_cast<void*>(static_cast<TObject*>(Form1->GetRoot())));
  SetOnClick(Button, Click);
  EXPECT_EQ(Designer1->GetMethodName(OnClickOf(Button)), "Button1Click");
  EXPECT_EQ(Form1->GetRoot()->MethodAddress("button1click"), Click.Code);
  // The same name again gives the same method.
  EXPECT_EQ(Designer1->CreateMethod("Button1Click", NotifyEvent()), Click);
  EXPECT_EQ(OwnMethods(Form1), std::vector<String>{"Button1Click"});
  // A method of something else has no name here; an empty name makes nothing.
  EXPECT_EQ(Designer1->GetMethodName(TMethod{Click.Code, Button}), "");
  EXPECT_EQ(Designer1->GetMethodName(TMethod{}), "");
  EXPECT_FALSE(Designer1->CreateMethod("", NotifyEvent()).IsAssigned());

  // The source answers what it has.
  std::vector<String> Listed;
  Designer1->GetMethods(NotifyEvent(), [&](const String& N) { Listed.push_back(N); });
  EXPECT_EQ(Listed, (std::vector<String>{"Button1Click", "Button1Click"}));
  EXPECT_TRUE(Designer1->MethodExists("BUTTON1CLICK"));
  EXPECT_FALSE(Designer1->MethodExists("OkClick"));

  // The host renames its text; the class follows when the host says so.
  Designer1->RenameMethod("Button1Click", "OkClick");
  EXPECT_EQ(Designer1->GetMethodName(OnClickOf(Button)), "Button1Click");
  Kiln->RenameRootMethod("Button1Click", "OkClick");
  EXPECT_EQ(Designer1->GetMethodName(OnClickOf(Button)), "OkClick");
  EXPECT_EQ(OnClickOf(Button).Code, Click.Code);
  Kiln->RenameRootMethod("Nothing", "Other"); // no such method: nothing happens
  Designer1->ShowMethod("OkClick");
  Designer1->ChainCall("OkClick", "Button2", "Button2Click", NotifyEvent());

  // What the host heard, in order.
  EXPECT_EQ(CallsOf({"CheckWritable", "CreateMethod", "RenameMethod", "ShowMethod", "ChainCall", "Modified"}),
            (std::vector<String>{"CheckWritable", "CreateMethod(Button1Click)", "CheckWritable",
                                 "CreateMethod(Button1Click)", "RenameMethod(Button1Click,OkClick)", "Modified",
                                 "ShowMethod(OkClick)", "ChainCall(OkClick,Button2,Button2Click)"}));
}

TEST_F(NamesFixture, AHandlerTheHostRefusesIsNotMade) {
  IPtr<TRecordingModule> Module;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module);
  IPtr<IDesigner> Designer1 = QueryAs<IDesigner>(Form1);
  Module->ReadOnly = true;
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Designer1->CreateMethod("Button1Click", NotifyEvent()); }),
            "The module is read-only");
  Module->ReadOnly = false;
  Module->Refuse = {"CreateMethod", "RenameMethod", "ShowMethod", "ChainCall"};
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Designer1->CreateMethod("Button1Click", NotifyEvent()); }),
            "The host refused CreateMethod");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Designer1->RenameMethod("A", "B"); }),
            "The host refused RenameMethod");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Designer1->ShowMethod("A"); }), "The host refused ShowMethod");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Designer1->ChainCall("A", "B", "C", NotifyEvent()); }),
            "The host refused ChainCall");
  EXPECT_TRUE(OwnMethods(Form1).empty());
  EXPECT_TRUE(Module->SourceMethods.empty());
}

TEST_F(NamesFixture, HandlersStayBoundThroughRenamesOfTheModule) {
  IPtr<TRecordingModule> Module;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module);
  TKilnRoot* Kiln = KilnRoot(Form1);
  TComponent* Form = Form1->GetRoot();
  TMethod Show = Kiln->CreateMethod("Form1Show", NotifyEvent());
  SetMethodProp(Form, GetPropInfo(Form, "OnShow"), Show);

  Kiln->SetRootName("MainForm");
  EXPECT_EQ(Form->ClassName(), "TMainForm");
  EXPECT_EQ(Kiln->GetMethodName(GetMethodProp(Form, GetPropInfo(Form, "OnShow"))), "Form1Show");
  // The host renames the handler after the module; the class follows, the code stays.
  Kiln->RenameMethod("Form1Show", "MainFormShow");
  Kiln->RenameRootMethod("Form1Show", "MainFormShow");
  TMethod Now = GetMethodProp(Form, GetPropInfo(Form, "OnShow"));
  EXPECT_EQ(Now, Show);
  EXPECT_EQ(Kiln->GetMethodName(Now), "MainFormShow");
  EXPECT_EQ(OwnMethods(Form1), std::vector<String>{"MainFormShow"});
  EXPECT_EQ(Module->SourceMethods, std::vector<String>{"MainFormShow"});
  // A file rename keeps the class and its methods.
  Form1->Rename("Main.kfm");
  EXPECT_EQ(Form->QualifiedClassName(), "Unit1.TMainForm");
  EXPECT_EQ(Kiln->GetMethodName(Now), "MainFormShow");
}

TEST_F(NamesFixture, AHandlerFromTheAncestorIsKnownByTheParentClass) {
  WithInheritance();
  IPtr<IRoot> Form1 = NewForm("Form1");
  TButton* Button = Add<TButton>(Form1);
  TMethod Click = KilnRoot(Form1)->CreateMethod("Button1Click", NotifyEvent());
  SetOnClick(Button, Click);
  IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
  TKilnRoot* Kiln2 = KilnRoot(Form2);
  TComponent* Inherited = Form2->GetRoot()->FindComponent("Button1");

  // The copy holds the ancestor's method, bound to the descendant's root.
  TMethod InheritedClick = OnClickOf(Inherited);
  EXPECT_EQ(InheritedClick.Code, Click.Code);
  EXPECT_EQ(InheritedClick.Data, static_cast<void*>(static_cast<TObject*>(Form2->GetRoot())));
  EXPECT_EQ(Kiln2->GetMethodName(InheritedClick), "Button1Click");
  EXPECT_TRUE(Kiln2->MethodFromAncestor(InheritedClick));
  // The descendant's own handler, and the ancestor's own, are not inherited.
  TMethod Own = Kiln2->CreateMethod("Button1DblClick", NotifyEvent());
  EXPECT_FALSE(Kiln2->MethodFromAncestor(Own));
  EXPECT_FALSE(KilnRoot(Form1)->MethodFromAncestor(Click));
  EXPECT_FALSE(Kiln2->MethodFromAncestor(TMethod{}));
  // Asking the descendant for the ancestor's handler gives the ancestor's method.
  EXPECT_EQ(Kiln2->CreateMethod("Button1Click", NotifyEvent()).Code, Click.Code);
  EXPECT_EQ(OwnMethods(Form2), std::vector<String>{"Button1DblClick"});
}

TEST_F(NamesFixture, ReadingTheModuleMakesTheHandlersItNames) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  IPtr<IRoot> Form2 = NewForm("Form2");
  TKilnRoot* Kiln = KilnRoot(Form1);
  TObjectGuard<TMemoryStream> Nothing(new TMemoryStream);
  TObjectGuard<TReader> Reader(new TReader(Nothing.Get(), 16));
  Reader->SetRoot(Form1->GetRoot());
  void* Address = nullptr;
  bool Error = true;
  Kiln->FindObjectMethod(Reader.Get(), "Form1Show", Address, Error);
  EXPECT_FALSE(Error);
  EXPECT_NE(Address, nullptr);
  EXPECT_EQ(Form1->GetRoot()->MethodAddress("Form1Show"), Address);
  // A method found already, and a read of another module's root, are left alone.
  void* Found = Address;
  Kiln->FindObjectMethod(Reader.Get(), "Other", Address, Error);
  EXPECT_EQ(Address, Found);
  Reader->SetRoot(Form2->GetRoot());
  Address = nullptr;
  Error = true;
  Kiln->FindObjectMethod(Reader.Get(), "Other", Address, Error);
  Kiln->ReaderFindMethod(Reader.Get(), "Other", Address, Error);
  String Name = "Form1Show";
  Kiln->ReaderReferenceName(Reader.Get(), Name);
  EXPECT_EQ(Address, nullptr);
  EXPECT_TRUE(Error);
  EXPECT_EQ(OwnMethods(Form1), std::vector<String>{"Form1Show"});
  EXPECT_EQ(Kiln->Events().GetCount(), 0);
}

//===----------------------------------------------------------------------===//
// What the host is told of an object's events
//===----------------------------------------------------------------------===//

TEST_F(NamesFixture, TheHostSeesAnObjectsEventsAndWhatLiesBelowIt) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  IPtr<IRoot> Form2 = NewForm("Form2");
  TKilnRoot* Kiln = KilnRoot(Form1);
  auto* Source = static_cast<TColumnSource*>(Kiln->CreateComponent(TColumnSource::StaticClass(), nullptr, 0, 0, 0, 0));
  ASSERT_EQ(Source->Name(), "ColumnSource1");
  static_cast<TColumn*>(Source->FColumns->Add())->OnClick = TNotifyEvent(Kiln->CreateMethod("Column0Click", NotifyEvent()));
  Source->FColumns->Add();
  Source->FBuddy = Add<TButton>(Form1);
  Source->FOnChange = TNotifyEvent(Kiln->CreateMethod("SourceChange", NotifyEvent()));
  Source->FOnStart = TNotifyEvent(KilnRoot(Form2)->CreateMethod("Form2Start", NotifyEvent())); // another module's

  IPtr<ICompInfo> Info = NewAs<ICompInfo, TCompInfo>(QueryAs<IInternalRoot>(Form1), Source);
  EXPECT_EQ(Info->GetClassName(), "TColumnSource");
  EXPECT_EQ(Info->GetQualifiedClassName(), "Tests.TColumnSource");
  EXPECT_EQ(Info->GetNamePath(), "ColumnSource1");
  EXPECT_EQ(QueryAs<IDesignPersistent>(Info->GetComponentHandle())->GetPersistent(), Source);
  // The events, sorted by name; a handler counts only when it is this module's.
  ASSERT_EQ(Info->GetEventCount(), 2);
  EXPECT_EQ(Info->GetEventName(0), "OnChange");
  EXPECT_EQ(Info->GetEventName(1), "OnStart");
  EXPECT_EQ(Info->GetEventInfo(1)->Name, "OnStart");
  EXPECT_EQ(Info->GetEventValue(0), "SourceChange");
  EXPECT_EQ(Info->GetEventValue(1), "");
  IPtr<IEventInfo> Signature = Info->GetIEventInfo(0);
  ASSERT_EQ(Signature->GetParamCount(), 1);
  EXPECT_EQ(Signature->GetParamName(0), "Sender");
  EXPECT_EQ(MessageOf<EListError>([&] { Info->GetEventName(2); }), "List index out of bounds (2)");

  // Below it: the sub-component, the collection, the empty style, the filled style; the
  // plain reference is not below it.
  ASSERT_EQ(Info->GetSubInfoCount(), 4);
  EXPECT_EQ(Info->GetSubInfo(0)->GetClassName(), "TTimer");
  EXPECT_EQ(Info->GetSubInfo(0)->GetEventName(0), "OnTimer");
  IPtr<ICompInfo> Columns = Info->GetSubInfo(1);
  EXPECT_EQ(Columns->GetNamePath(), "ColumnSource1.Columns");
  EXPECT_EQ(Columns->GetEventCount(), 0);
  EXPECT_EQ(Info->GetSubInfo(2), nullptr);
  EXPECT_EQ(Info->GetSubInfo(3)->GetClassName(), "THeaderStyle");
  EXPECT_EQ(MessageOf<EListError>([&] { Info->GetSubInfo(4); }), "List index out of bounds (4)");
  // A collection's items count after its own sub-objects.
  ASSERT_EQ(Columns->GetSubInfoCount(), 2);
  EXPECT_EQ(Columns->GetSubInfo(0)->GetNamePath(), "ColumnSource1.Columns[0]");
  EXPECT_EQ(Columns->GetSubInfo(0)->GetEventValue(0), "Column0Click");
  EXPECT_EQ(Columns->GetSubInfo(1)->GetEventValue(0), "");

  // An item is named through its component; one in a module nobody knows keeps its path.
  EXPECT_EQ(Kiln->GetObjectName(Source->FColumns->Items(1)), "ColumnSource1.Columns[1]");
  EXPECT_EQ(KilnRoot(Form2)->GetObjectName(Source->FColumns->Items(1)), "ColumnSource1.Columns[1]");
  Source->SetName("Source");
  EXPECT_EQ(Kiln->GetObjectName(Source->FColumns), "Source.Columns");
  EXPECT_EQ(Kiln->GetObjectName(Source->FHeader), "THeaderStyle");
}

TEST_F(NamesFixture, ClearingAnEventGoesBackToTheAncestorWhenItCan) {
  WithInheritance(); // the module gets an update manager
  TRootHooks::UpdateManagerCanRevert = [](const IPtr<IUpdateManager>&, TPersistent*, PPropInfo Prop) {
    return Prop->Name == "OnStart";
  };
  TRootHooks::UpdateManagerRevert = [this](const IPtr<IUpdateManager>&, TPersistent* Instance, PPropInfo Prop) {
    Log.Add("Revert(" + Instance->GetNamePath() + "." + Prop->Name + ")");
  };
  auto Restore = Finally([]() noexcept {
    TRootHooks::UpdateManagerCanRevert = nullptr;
    TRootHooks::UpdateManagerRevert = nullptr;
  });
  IPtr<IRoot> Form1 = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Form1);
  auto* Source = static_cast<TColumnSource*>(Kiln->CreateComponent(TColumnSource::StaticClass(), nullptr, 0, 0, 0, 0));
  Source->FOnChange = TNotifyEvent(Kiln->CreateMethod("SourceChange", NotifyEvent()));
  Source->FOnStart = TNotifyEvent(Kiln->CreateMethod("SourceStart", NotifyEvent()));
  IPtr<ICompInfo> Info = NewAs<ICompInfo, TCompInfo>(QueryAs<IInternalRoot>(Form1), Source);
  Log.Clear();

  Info->ClearEvent(0); // nothing to go back to: unassigned
  EXPECT_FALSE(Source->FOnChange.IsAssigned());
  Info->ClearEvent(1); // the ancestor's value
  EXPECT_TRUE(Source->FOnStart.IsAssigned());
  EXPECT_EQ(CallsOf({"Revert", "Modified"}),
            (std::vector<String>{"Modified", "Revert(ColumnSource1.OnStart)", "Modified", "Modified"}));
  EXPECT_EQ(MessageOf<EListError>([&] { Info->ClearEvent(2); }), "List index out of bounds (2)");
}

TEST_F(NamesFixture, TheMethodWalkReachesSubObjectsAndChildren) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Form1);
  TPanel* Panel = Add<TPanel>(Form1);
  auto* Inner = static_cast<TButton*>(Kiln->CreateComponent(TButton::StaticClass(), Panel, 4, 4, 75, 25));
  auto* Source = static_cast<TColumnSource*>(Kiln->CreateComponent(TColumnSource::StaticClass(), nullptr, 0, 0, 0, 0));
  Source->FColumns->Add();
  Kiln->Select(Panel, false);
  Kiln->Select(Source, true);
  std::vector<String> Met;
  bool StopAtHeader = false;
  auto Walk = [&] {
    Met.clear();
    Kiln->IterateMethods([&](TPersistent* Instance, PPropInfo Prop) {
      Met.push_back(Instance->GetNamePath() + "." + Prop->Name);
      return StopAtHeader && Instance == Source->FHeader;
    });
  };
  Walk();
  // The panel's events and its child's; the source's style in declared order, not its
  // sub-component, its collection's items, or what it refers to.
  EXPECT_EQ(Met, (std::vector<String>{"Panel1.OnClick", Inner->Name() + ".OnClick", "THeaderStyle.OnChange",
                                      "ColumnSource1.OnStart", "ColumnSource1.OnChange"}));
  // An answer of true ends the walk of the object that has the event.
  StopAtHeader = true;
  Walk();
  EXPECT_EQ(Met, (std::vector<String>{"Panel1.OnClick", Inner->Name() + ".OnClick", "THeaderStyle.OnChange"}));
}

//===----------------------------------------------------------------------===//
// Pasting
//===----------------------------------------------------------------------===//

/// Module Form1 with Button1 (OnClick Button1Click) and Edit1, which a paste copies from
/// module Form2: Button1 (OnClick Button1Click), Button11 (OnClick Button11Click), Edit1
/// (OnChange Edit1Change1, OnClick Button1Click) and Label1 (FocusControl Edit1).
struct PasteTest : NamesFixture {
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1, Form2;
  TKilnRoot* Kiln = nullptr;
  TButton* Button1 = nullptr;
  TEdit* Edit1 = nullptr;
  std::vector<TComponent*> Copied;
  std::vector<TComponent*> Pasted;
  std::vector<String> Temporary; // the methods of the class between the read and the end

  void SetUp() override {
    NamesFixture::SetUp();
    Form1 = NewForm("Form1", &Module1);
    Kiln = KilnRoot(Form1);
    Button1 = Add<TButton>(Form1);
    SetOnClick(Button1, Kiln->CreateMethod("Button1Click", NotifyEvent()));
    Edit1 = Add<TEdit>(Form1, nullptr, 40);
    Form2 = NewForm("Form2");
    TKilnRoot* Source = KilnRoot(Form2);
    auto* B1 = Add<TButton>(Form2);
    auto* B11 = Add<TButton>(Form2, nullptr, 40);
    B11->SetName("Button11");
    auto* E1 = Add<TEdit>(Form2, nullptr, 80);
    auto* L1 = Add<TLabel>(Form2, nullptr, 120);
    TMethod Click = Source->CreateMethod("Button1Click", NotifyEvent());
    SetOnClick(B1, Click);
    SetOnClick(B11, Source->CreateMethod("Button11Click", NotifyEvent()));
    SetMethodProp(E1, GetPropInfo(E1, "OnChange"), Source->CreateMethod("Edit1Change1", NotifyEvent()));
    SetOnClick(E1, Click);
    L1->SetFocusControl(E1);
    Copied = {B1, B11, E1, L1};
    Log.Clear();
  }
  void TearDown() override {
    if (Kiln) Kiln->EndPasteRead();
    NamesFixture::TearDown();
  }

  /// A selection stream of `Copied`, written as the copy of a selection writes it, then
  /// `MethodText` and the end.
  TObjectGuard<TMemoryStream> Stream(TComponent* From, const String& MethodText) {
    TObjectGuard<TMemoryStream> S(new TMemoryStream);
    {
      TObjectGuard<TWriter> Writer(new TWriter(S.Get(), 1024));
      Writer->SetRoot(From);
      for (TComponent* C : Copied) {
        Writer->WriteSignature();
        Writer->WriteComponent(C);
      }
      Writer->WriteValue(vaNull);
      Writer->Write(MethodText.data(), static_cast<std::int64_t>(MethodText.size()));
      Writer->WriteValue(vaNull);
    }
    S->SetPosition(0);
    return S;
  }
  /// Reads `Text` into Form1 as a paste does and selects what came.
  void Paste(TStream* Text) {
    Pasted.clear();
    TObjectGuard<TReader> Reader(new TReader(Text, 1024));
    Kiln->BeginPasteRead(Reader.Get());
    Reader->ReadComponents(Form1->GetRoot(), Form1->GetRoot(), [&](TComponent* C) { Pasted.push_back(C); });
    Temporary = OwnMethods(Form1);
    Kiln->ClearSelection();
    for (TComponent* C : Pasted) Kiln->Select(C, true);
    Kiln->FinishPasteRead(Reader.Get());
  }
  String HandlerOf(TComponent* C, const char* Event = "OnClick") {
    return Kiln->GetMethodName(GetMethodProp(C, GetPropInfo(C, Event)));
  }
  static const String& MethodText() {
    static const String Text = "procedure Button11Click;\nprocedure Button1Click;\nprocedure Edit1Change1;\n";
    return Text;
  }
};

TEST_F(PasteTest, PastedHandlersFollowTheirRenamedComponents) {
  TObjectGuard<TMemoryStream> Text = Stream(Form2->GetRoot(), MethodText());
  Paste(Text.Get());
  ASSERT_EQ(Pasted.size(), 4u);
  auto* B = Pasted[0];
  auto* B11 = Pasted[1];
  auto* E = Pasted[2];
  auto* L = static_cast<TLabel*>(Pasted[3]);
  // Taken names are made free; a reference inside the text follows its component.
  EXPECT_EQ(B->Name(), "Button2");
  EXPECT_EQ(B11->Name(), "Button11");
  EXPECT_EQ(E->Name(), "Edit2");
  EXPECT_EQ(L->Name(), "Label1");
  EXPECT_EQ(L->FocusControl(), E);

  // While read, each distinct handler had one temporary method, named by a counter.
  ASSERT_EQ(Temporary.size(), 4u);
  EXPECT_EQ(Temporary[0], "Button1Click");
  for (size_t I = 1; I < 4; ++I) {
    EXPECT_EQ(Temporary[I][0], '@');
    if (I > 1) {
      EXPECT_EQ(std::stoi(Temporary[I].substr(1)), std::stoi(Temporary[I - 1].substr(1)) + 1);
    }
  }
  ASSERT_EQ(Kiln->Events().GetCount(), 3);
  EXPECT_EQ(OnClickOf(B).Code, OnClickOf(E).Code); // two events, one method

  // The handler of a renamed component follows it; Button11Click is not Button1's; a
  // letter after the prefix is enough.
  EXPECT_EQ(HandlerOf(B), "Button2Click");
  EXPECT_EQ(HandlerOf(E), "Button2Click");
  EXPECT_EQ(HandlerOf(B11), "Button11Click");
  EXPECT_EQ(HandlerOf(E, "OnChange"), "Edit2Change1");
  EXPECT_EQ(HandlerOf(Button1), "Button1Click"); // the module's own is untouched
  EXPECT_EQ(OwnMethods(Form1), (std::vector<String>{"Button1Click", "Button2Click", "Button11Click", "Edit2Change1"}));
  // The host heard of each pasted component as it joined (still unnamed) and as it was
  // named, then got the text with every rename and inserted the methods.
  EXPECT_EQ(Module1->InsertedText, MethodText());
  EXPECT_EQ(CallsOf({"RenameComponent", "InsertMethodSource"}),
            (std::vector<String>{"RenameComponent(,)", "RenameComponent(,Button2)", "RenameComponent(,)",
                                 "RenameComponent(,Button11)", "RenameComponent(,)", "RenameComponent(,Edit2)",
                                 "RenameComponent(,)", "RenameComponent(,Label1)",
                                 "InsertMethodSource(Button1=Button2,Edit1=Edit2,Button1Click=Button2Click,"
                                 "Edit1Change1=Edit2Change1)"}));
  EXPECT_EQ(Module1->SourceMethods,
            (std::vector<String>{"Button1Click", "Button11Click", "Button2Click", "Edit2Change1"}));
}

TEST_F(PasteTest, AHandlerThatDidNotReachTheSourceFallsBackOnItsPastedName) {
  // The module has a Button11Click of its own, so the pasted one is made free as
  // Button11Click2; the host leaves that one and Edit2Change1 out.
  TMethod Own = Kiln->CreateMethod("Button11Click", NotifyEvent());
  Module1->SkipInsert = {"Button11Click2", "Edit2Change1"};
  TObjectGuard<TMemoryStream> Text = Stream(Form2->GetRoot(), MethodText());
  Log.Clear();
  Paste(Text.Get());
  auto* B11 = Pasted[1];
  auto* E = Pasted[2];
  EXPECT_EQ(CallsOf({"InsertMethodSource"}),
            std::vector<String>{"InsertMethodSource(Button1=Button2,Edit1=Edit2,Button1Click=Button2Click,"
                                "Button11Click=Button11Click2,Edit1Change1=Edit2Change1)"});
  // On the module's method of the name in the text, if there is one; else on nothing.
  EXPECT_EQ(OnClickOf(B11), Own);
  EXPECT_FALSE(GetMethodProp(E, GetPropInfo(E, "OnChange")).IsAssigned());
  EXPECT_EQ(HandlerOf(E), "Button2Click");
  EXPECT_EQ(OwnMethods(Form1), (std::vector<String>{"Button1Click", "Button11Click", "Button2Click"}));
}

TEST_F(PasteTest, APasteWithoutMethodTextSharesTheModulesHandlers) {
  // A copy within the module: no method text, and the host is not asked.
  Copied = {Button1};
  TObjectGuard<TMemoryStream> Text = Stream(Form1->GetRoot(), "");
  Paste(Text.Get());
  ASSERT_EQ(Pasted.size(), 1u);
  EXPECT_EQ(Pasted[0]->Name(), "Button2");
  EXPECT_EQ(OnClickOf(Pasted[0]), OnClickOf(Button1));
  EXPECT_EQ(HandlerOf(Pasted[0]), "Button1Click");
  EXPECT_EQ(OwnMethods(Form1), std::vector<String>{"Button1Click"});
  EXPECT_EQ(Log.Count("InsertMethodSource"), 0);
  // The names of temporary methods are never used again, also after a paste ended.
  String First = Temporary.back();
  Kiln->EndPasteRead();
  EXPECT_EQ(Kiln->Events().GetCount(), 0);
  EXPECT_EQ(Kiln->Renames().GetCount(), 0);
  TObjectGuard<TMemoryStream> Again = Stream(Form1->GetRoot(), "");
  Paste(Again.Get());
  EXPECT_GT(std::stoi(Temporary.back().substr(1)), std::stoi(First.substr(1)));
  EXPECT_EQ(Pasted[0]->Name(), "Button3");
}

TEST_F(PasteTest, MethodTextTheHostRefusesLeavesTheHandlersFallenBack) {
  Module1->Refuse = {"InsertMethodSource"};
  TObjectGuard<TMemoryStream> Text = Stream(Form2->GetRoot(), MethodText());
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Paste(Text.Get()); }),
            "The host refused InsertMethodSource");
  ASSERT_EQ(Pasted.size(), 4u); // what was read stays
  EXPECT_EQ(OnClickOf(Pasted[0]), OnClickOf(Button1));
  EXPECT_FALSE(OnClickOf(Pasted[1]).IsAssigned());
  EXPECT_FALSE(HasTemporaryMethod(Form1));
  EXPECT_EQ(OwnMethods(Form1), std::vector<String>{"Button1Click"});
}

TEST(RenamesTest, TheFirstMatchingRenameWinsWithoutRegardToCase) {
  TRenames Renames;
  Renames.Add("Button1", "Button3");
  Renames.Add("BUTTON1", "Button9");
  String Name = "button1";
  Renames.Rename(Name);
  EXPECT_EQ(Name, "Button3");
  Name = "Edit1";
  Renames.Rename(Name);
  EXPECT_EQ(Name, "Edit1");
  EXPECT_EQ(Renames.GetCount(), 2);
  EXPECT_EQ(Renames.GetItems(1).Target, "Button9");
  EXPECT_THROW(Renames.GetItems(2), EListError);

  TEvents Events;
  int Code = 0;
  Events.Add(&Code, "Button1Click");
  TEventItem& Item = Events.GetItems(0);
  EXPECT_EQ(Item.Value, &Code);
  EXPECT_EQ(Item.NewValue, &Code);
  EXPECT_EQ(Item.Name, "Button1Click");
  EXPECT_EQ(Item.OriginalName, "Button1Click");
  EXPECT_EQ(Events.Find("BUTTON1CLICK"), &Item);
  EXPECT_EQ(Events.Find("Other"), nullptr);
}
