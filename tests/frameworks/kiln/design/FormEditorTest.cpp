//===- tests/frameworks/kiln/design/FormEditorTest.cpp - A Kiln module through the tool interfaces ===//
//
// An add-in's view of a Kiln module: properties read and written by name in
// the buffer layout of each kind, children walked, components made, selected,
// focused and deleted through `IOTAComponent`; notifiers told in order, handles
// used again, a notifier that leaves during a call; the module's stream read
// and swapped, live and dormant; the descendant that forgets its ancestor's
// module; the platform-name rules.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "core/IStreams.h"
#include "core/root/RootFormEditor.h"
#include "platform/ScopeGuard.h"
#include "platform/Variants.h"

#include <cstdlib>
#include <cstring>
#include <ctime>

using namespace formkit;
using namespace formkit::fakes;
using namespace std::string_literals;

namespace {

FK_ALIAS(TGaugeShortText, tkString)
FK_ALIAS(TGaugeAnsiText, tkLString)

/// A control with a property of every kind the tool interfaces carry.
class TGauge : public TControl {
  FK_CLASS(TGauge, TControl)
public:
  double FRatio = 0.5;
  String FShort = "short";
  String FAnsi = "ansi";
  WideString FWide = u"wide";
  TVariant FValue = 7;
  char FLetter = 'a';
  char16_t FWideLetter = u'\u00e9';
  std::int8_t FSmall = -3;
  std::uint8_t FPercent = 50;
  std::int16_t FOffset = -300;
  std::uint16_t FSpan = 60000;
  std::uint32_t FMask = 1;
  TShiftState FShift;
  std::int64_t FBig = 1;
  TNotifyEvent FOnChange;
};
FK_IMPLEMENT(TGauge, "FormEditorTest") {
  B.Field("Ratio", &TGauge::FRatio);
  B.Field("Short", &TGauge::FShort).Type(&TypeInfo_TGaugeShortText);
  B.Field("Ansi", &TGauge::FAnsi).Type(&TypeInfo_TGaugeAnsiText);
  B.Field("Wide", &TGauge::FWide);
  B.Field("Value", &TGauge::FValue);
  B.Field("Letter", &TGauge::FLetter);
  B.Field("WideLetter", &TGauge::FWideLetter);
  B.Field("Small", &TGauge::FSmall);
  B.Field("Percent", &TGauge::FPercent);
  B.Field("Offset", &TGauge::FOffset);
  B.Field("Span", &TGauge::FSpan);
  B.Field("Mask", &TGauge::FMask);
  B.Field("Shift", &TGauge::FShift);
  B.Field("Big", &TGauge::FBig);
  B.Event("OnChange", &TGauge::FOnChange);
}

/// A notifier of a form editor that logs what it hears as "<name>.<call>". Told
/// `Destroyed`, it leaves the editor as the contract asks; `LeaveOnModified` makes it
/// leave during the walk of a change.
class TFormWatcher : public TInterfacedObject, public IOTAFormNotifier {
  FK_CLASS(TFormWatcher, TInterfacedObject)
  FK_INTERFACES(IOTAFormNotifier)
public:
  TFormWatcher(String Name = "", TCallLog* Log = nullptr) : FName(std::move(Name)), FLog(Log) {}
  void AfterSave() override { FLog->Add(FName + ".AfterSave"); }
  void BeforeSave() override { FLog->Add(FName + ".BeforeSave"); }
  void Destroyed() override {
    FLog->Add(FName + ".Destroyed");
    Leave();
  }
  void Modified() override {
    FLog->Add(FName + ".Modified");
    if (LeaveOnModified) Leave();
  }
  void FormActivated() override { FLog->Add(FName + ".FormActivated"); }
  void FormSaving() override { FLog->Add(FName + ".FormSaving"); }
  void ComponentRenamed(TOTAHandle Handle, const String& OldName, const String& NewName) override {
    FLog->Add(FName + ".ComponentRenamed(" + static_cast<TComponent*>(Handle)->ClassName() + "," + OldName + "," +
              NewName + ")");
  }
  /// Registers with `Editor` (not counted: the editor's list holds the watcher).
  void Join(IOTAFormEditor* Editor) {
    FEditor = Editor;
    Handle = Editor->AddNotifier(IPtr<IOTANotifier>(static_cast<IOTAFormNotifier*>(this)));
  }
  void Leave() {
    if (FEditor && Handle >= 0) std::exchange(FEditor, nullptr)->RemoveNotifier(std::exchange(Handle, -1));
  }
  int Handle = -1;
  bool LeaveOnModified = false;

private:
  String FName;
  TCallLog* FLog;
  IOTAFormEditor* FEditor = nullptr;
};

/// A notifier that is no form notifier: it hears only the four plain notifications.
class TPlainWatcher : public TInterfacedObject, public IOTANotifier {
  FK_CLASS(TPlainWatcher, TInterfacedObject)
  FK_INTERFACES(IOTANotifier)
public:
  explicit TPlainWatcher(TCallLog* Log = nullptr) : FLog(Log) {}
  void AfterSave() override {}
  void BeforeSave() override {}
  void Destroyed() override { FLog->Add("Plain.Destroyed"); }
  void Modified() override { FLog->Add("Plain.Modified"); }

private:
  TCallLog* FLog;
};
FK_IMPLEMENT(TFormWatcher, "FormEditorTest") {}
FK_IMPLEMENT(TPlainWatcher, "FormEditorTest") {}

/// The whole content of a host stream, read from its position.
String ReadAll(const IPtr<IStream>& Stream) {
  String Bytes;
  char Buffer[4096];
  for (std::int64_t N; (N = Stream->Read(Buffer, sizeof Buffer)) > 0;) Bytes.append(Buffer, static_cast<std::size_t>(N));
  return Bytes;
}

/// A host stream holding `Bytes`, at its start.
IPtr<IStream> HostStream(const String& Bytes) {
  auto* Memory = new TMemoryStream;
  Memory->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  Memory->SetPosition(0);
  return NewAs<IStream, TStreamAdapter>(Memory, soOwned);
}

/// A host stream of ten bytes whose reads fail.
class TFailingStream : public TInterfacedObject, public IStream {
  FK_CLASS(TFailingStream, TInterfacedObject)
  FK_INTERFACES(IStream)
public:
  std::int64_t Read(void*, std::int64_t) override { throw EStreamError("The host's stream failed"); }
  std::int64_t Write(const void*, std::int64_t) override { return 0; }
  std::int64_t Seek(std::int64_t Offset, int Origin) override {
    FPosition = Origin == 0 ? Offset : Origin == 1 ? FPosition + Offset : 10 + Offset;
    return FPosition;
  }
  void SetSize(std::int64_t) override {}

private:
  std::int64_t FPosition = 0;
};
FK_IMPLEMENT(TFailingStream, "FormEditorTest") {}

struct FormEditorTest : KilnDesignFixture {
  IPtr<IRoot> Form;
  IPtr<TRecordingModule> Module;
  TComponentRoot* Root = nullptr;
  IPtr<IOTAFormEditor> Editor;
  TCallLog Heard;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    RegisterClass(TGauge::StaticClass());
    Form = NewForm("Form1", &Module);
    Root = KilnRoot(Form);
    auto* Button = static_cast<TButton*>(Root->CreateComponent(TButton::StaticClass(), Form->GetRoot(), 8, 8, 75, 25));
    Button->SetCaption("Go");
    TComponent* Panel = Root->CreateComponent(TPanel::StaticClass(), Form->GetRoot(), 8, 48, 185, 41);
    Root->CreateComponent(TButton::StaticClass(), Panel, 4, 4, 60, 20);
    Root->CreateComponent(TLabel::StaticClass(), Form->GetRoot(), 100, 8, 40, 13);
    Editor = Root->GetFormEditor();
  }
  void TearDown() override {
    Editor = nullptr;
    Form = nullptr;
    Module = nullptr;
    UnRegisterClass(TGauge::StaticClass());
    KilnDesignFixture::TearDown();
  }
  IPtr<IOTAComponent> Find(const String& Name) {
    IPtr<IOTAComponent> Found = Editor->FindComponent(Name);
    EXPECT_TRUE(Found) << Name;
    return Found;
  }
  static TComponent* ObjectOf(const IPtr<IOTAComponent>& Component) {
    return QueryAs<INTAComponent>(Component)->GetComponent();
  }
  String Content() { return ReadAll(QueryAs<IOTAEditorContent>(Editor)->GetContent()); }
};

//===----------------------------------------------------------------------===//
// The facade
//===----------------------------------------------------------------------===//

TEST_F(FormEditorTest, OneFacadePerRootAnsweringForTheModule) {
  EXPECT_EQ(Root->GetFormEditor().Get(), Editor.Get()) << "made once, at first use";
  EXPECT_EQ(Editor->GetFileName(), "Form1.kfm");
  EXPECT_EQ(Editor->GetModule().Get(), static_cast<IOTAModule*>(Module.Get()));
  EXPECT_EQ(QueryAs<INTAFormEditor>(Editor)->GetFormDesigner().Get(), Root->AsDesigner().Get());
  EXPECT_EQ(ObjectOf(Editor->GetRootComponent()), Form->GetRoot());
  EXPECT_EQ(Editor->FindComponent("NoSuchThing"), nullptr);
  EXPECT_EQ(Editor->GetComponentFromHandle(nullptr), nullptr);
  TComponent* Button = Form->GetRoot()->FindComponent("Button1");
  IPtr<IOTAComponent> FromHandle = Editor->GetComponentFromHandle(Button);
  EXPECT_EQ(ObjectOf(FromHandle), Button);
  EXPECT_NE(FromHandle.Get(), Editor->GetComponentFromHandle(Button).Get()) << "a new wrapper each time";

  // Modified: the age of the content against the age at load; marking and resetting.
  QueryAs<IOTAEditorContent>(Editor)->ResetDiskAge();
  EXPECT_FALSE(Editor->GetModified());
  EXPECT_TRUE(Editor->MarkModified());
  EXPECT_TRUE(Editor->GetModified());
  QueryAs<IOTAEditorContent>(Editor)->ResetDiskAge();
  EXPECT_FALSE(Editor->GetModified());

  KilnRoot(Form)->DesignWindow()->Hide();
  Editor->Show();
  EXPECT_TRUE(KilnRoot(Form)->DesignWindow()->Visible());

  // The form resource: the module's stream, rewound, through a framework and a host stream.
  TMemoryStream Direct;
  QueryAs<INTAFormEditor>(Editor)->GetFormResource(&Direct);
  EXPECT_EQ(Direct.Position(), 0);
  String Bytes(reinterpret_cast<const char*>(Direct.Memory()), static_cast<std::size_t>(Direct.Size()));
  EXPECT_EQ(Bytes, Content());
  IPtr<IStream> Host = HostStream("");
  Editor->GetFormResource(Host);
  EXPECT_EQ(Host->Seek(0, 1), 0);
  EXPECT_EQ(ReadAll(Host), Bytes);

  // The palette as the engine asks it, through the host.
  auto Tools = New<TEnvironmentTools>(InterfaceOf<IDesignEnvironment>(Env.Get()));
  EXPECT_FALSE(Tools->ToolSelected());
  Arm(TButton::StaticClass());
  EXPECT_TRUE(Tools->ToolSelected());
  EXPECT_FALSE(New<TEnvironmentTools>()->ToolSelected());
}

//===----------------------------------------------------------------------===//
// Properties
//===----------------------------------------------------------------------===//

TEST_F(FormEditorTest, PropertiesReadAndWrittenByNameInTheLayoutOfTheirKind) {
  IPtr<IOTAComponent> Gauge = Editor->CreateComponent(nullptr, "TGauge", 10, 100, 50, 20);
  ASSERT_TRUE(Gauge);
  auto* Object = static_cast<TGauge*>(ObjectOf(Gauge));
  auto Watcher = New<TFormWatcher>("W", &Heard);
  Watcher->Join(Editor.Get());

  // Gets: 32 bits for every ordinal kind.
  std::int32_t Ordinal = 0;
  ASSERT_TRUE(Gauge->GetPropValueByName("Small", &Ordinal));
  EXPECT_EQ(Ordinal, -3);
  ASSERT_TRUE(Gauge->GetPropValueByName("span", &Ordinal)) << "names without regard to case";
  EXPECT_EQ(Ordinal, 60000);
  ASSERT_TRUE(Gauge->GetPropValueByName("Letter", &Ordinal));
  EXPECT_EQ(Ordinal, 'a');
  ASSERT_TRUE(Gauge->GetPropValueByName("WideLetter", &Ordinal));
  EXPECT_EQ(Ordinal, 0xE9);
  long double Extended = 0;
  ASSERT_TRUE(Gauge->GetPropValueByName("Ratio", &Extended));
  EXPECT_EQ(Extended, 0.5L);
  TOTAShortString Short;
  ASSERT_TRUE(Gauge->GetPropValueByName("Short", &Short));
  EXPECT_EQ(String(Short.Chars, Short.Length), "short");
  String Text;
  ASSERT_TRUE(Gauge->GetPropValueByName("Ansi", &Text));
  EXPECT_EQ(Text, "ansi");
  WideString Wide;
  ASSERT_TRUE(Gauge->GetPropValueByName("Wide", &Wide));
  EXPECT_EQ(Wide, u"wide");
  TVariant Value;
  ASSERT_TRUE(Gauge->GetPropValueByName("Value", &Value));
  EXPECT_EQ(Value, TVariant(7));
  TMethod Method{reinterpret_cast<void*>(1), reinterpret_cast<void*>(2)};
  ASSERT_TRUE(Gauge->GetPropValueByName("OnChange", &Method));
  EXPECT_EQ(Method.Code, nullptr);
  ASSERT_TRUE(Gauge->GetPropValueByName("Name", &Text));
  EXPECT_EQ(Text, "Gauge1");
  std::int64_t Big = 99;
  EXPECT_FALSE(Gauge->GetPropValueByName("Big", &Big)) << "a 64-bit ordinal has no layout";
  EXPECT_EQ(Big, 99);
  EXPECT_EQ(Gauge->GetPropTypeByName("Big"), tkInt64);
  EXPECT_EQ(Heard.Calls, std::vector<String>{}) << "reads change nothing";

  // Sets: each ordinal at the width of its ordinal type; each one ends with `Modified`.
  std::int8_t Small = -100;
  EXPECT_TRUE(Gauge->SetPropByName("Small", &Small));
  std::uint8_t Percent = 200;
  EXPECT_TRUE(Gauge->SetPropByName("Percent", &Percent));
  std::int16_t Offset = -30000;
  EXPECT_TRUE(Gauge->SetPropByName("Offset", &Offset));
  std::uint16_t Span = 65535;
  EXPECT_TRUE(Gauge->SetPropByName("Span", &Span));
  std::uint32_t Mask = 0xFFFFFFFFu;
  EXPECT_TRUE(Gauge->SetPropByName("Mask", &Mask));
  char Letter = 'z';
  EXPECT_TRUE(Gauge->SetPropByName("Letter", &Letter));
  std::uint16_t WideLetter = 0x263A;
  EXPECT_TRUE(Gauge->SetPropByName("WideLetter", &WideLetter));
  EXPECT_EQ(Object->FSmall, -100);
  EXPECT_EQ(Object->FPercent, 200);
  EXPECT_EQ(Object->FOffset, -30000);
  EXPECT_EQ(Object->FSpan, 65535);
  EXPECT_EQ(Object->FMask, 0xFFFFFFFFu);
  EXPECT_EQ(Object->FLetter, 'z');
  EXPECT_EQ(Object->FWideLetter, u'\u263a');
  std::int32_t Shift = 0;
  ASSERT_TRUE(Gauge->GetPropValueByName("Shift", &Shift));
  EXPECT_EQ(Shift, 0);
  Shift = 1 << ssCtrl;
  EXPECT_TRUE(Gauge->SetPropByName("Shift", &Shift));
  EXPECT_TRUE(Object->FShift.Contains(ssCtrl));

  Extended = 2.25L;
  EXPECT_TRUE(Gauge->SetPropByName("Ratio", &Extended));
  EXPECT_EQ(Object->FRatio, 2.25);
  Short.Length = 3;
  std::memcpy(Short.Chars, "abc", 3);
  EXPECT_TRUE(Gauge->SetPropByName("Short", &Short));
  EXPECT_EQ(Object->FShort, "abc");
  Text = "ansi text";
  EXPECT_TRUE(Gauge->SetPropByName("Ansi", &Text));
  EXPECT_EQ(Object->FAnsi, "ansi text");
  Wide = u"\u00e9t\u00e9";
  EXPECT_TRUE(Gauge->SetPropByName("Wide", &Wide));
  EXPECT_EQ(Object->FWide, u"\u00e9t\u00e9");
  Value = TVariant("seven");
  EXPECT_TRUE(Gauge->SetPropByName("Value", &Value));
  EXPECT_EQ(Object->FValue, TVariant("seven"));
  Text = "Meter";
  EXPECT_TRUE(Gauge->SetPropByName("Name", &Text));
  EXPECT_EQ(Object->Name(), "Meter");
  EXPECT_EQ(Heard.Count("W.Modified"), 14);

  // A short string reads back cut to 255 characters.
  Object->FShort = String(300, 'x');
  ASSERT_TRUE(Gauge->GetPropValueByName("Short", &Short));
  EXPECT_EQ(Short.Length, 255);

  // By index: declaration order, the framework's properties first.
  const int Count = Gauge->GetPropCount();
  EXPECT_EQ(Count, static_cast<int>(TGauge::StaticClass()->Properties().size()));
  EXPECT_EQ(Gauge->GetPropName(0), "Name");
  EXPECT_EQ(Gauge->GetPropName(Count - 1), "OnChange");
  EXPECT_EQ(Gauge->GetPropType(Count - 1), tkMethod);
  EXPECT_TRUE(Gauge->GetPropValue(Count - 1, &Method));
  // Outside the list: nothing stored, nothing changed.
  Heard.Clear();
  Ordinal = 42;
  EXPECT_EQ(Gauge->GetPropName(Count), "");
  EXPECT_EQ(Gauge->GetPropName(-1), "");
  EXPECT_EQ(Gauge->GetPropType(Count), tkUnknown);
  EXPECT_EQ(Gauge->GetPropTypeByName("NoSuchProp"), tkUnknown);
  EXPECT_FALSE(Gauge->GetPropValue(Count, &Ordinal));
  EXPECT_FALSE(Gauge->GetPropValue(-1, &Ordinal));
  EXPECT_FALSE(Gauge->GetPropValueByName("NoSuchProp", &Ordinal));
  EXPECT_EQ(Ordinal, 42);
  EXPECT_FALSE(Gauge->SetProp(Count, &Ordinal));
  EXPECT_FALSE(Gauge->SetPropByName("NoSuchProp", &Ordinal));
  EXPECT_FALSE(Gauge->SetPropByName("Big", &Big));
  EXPECT_EQ(Heard.Calls, std::vector<String>{});
  Watcher->Leave();
}

TEST_F(FormEditorTest, ObjectValuedPropertiesGiveWrappersOnlyForObjectsThatAreNoComponents) {
  IPtr<IOTAComponent> Button = Find("Button1");
  IPtr<IOTAComponent> Label = Find("Label1");
  auto Watcher = New<TFormWatcher>("W", &Heard);
  Watcher->Join(Editor.Get());

  // A persistent that is no component reads back as a wrapper of its own.
  IPtr<IOTAComponent> Font;
  ASSERT_TRUE(Button->GetPropValueByName("Font", &Font));
  ASSERT_TRUE(Font);
  EXPECT_EQ(Font->GetComponentType(), "TFont");
  EXPECT_EQ(Font->GetComponentHandle(), static_cast<TPersistent*>(static_cast<TButton*>(ObjectOf(Button))->Font()));
  EXPECT_EQ(QueryAs<INTAComponent>(Font)->GetComponent(), nullptr);
  std::int32_t Size = 0;
  ASSERT_TRUE(Font->GetPropValueByName("Size", &Size));
  EXPECT_GT(Size, 0);
  // What only a component can do, a persistent cannot.
  EXPECT_EQ(Font->GetParent(), nullptr);
  EXPECT_FALSE(Font->IsTControl());
  EXPECT_EQ(Font->GetComponentCount(), -1);
  EXPECT_EQ(Font->GetComponent(0), nullptr);
  EXPECT_EQ(Font->GetControlCount(), 0);
  EXPECT_EQ(Font->GetControl(0), nullptr);
  EXPECT_FALSE(Font->GetChildren(nullptr, [](void*, const IPtr<IOTAComponent>&, bool&) {}));
  EXPECT_FALSE(Font->Select(false));
  EXPECT_FALSE(Font->Focus(false));
  EXPECT_FALSE(Font->Delete());

  // A component, and nothing, read back as nil with success.
  static_cast<TLabel*>(ObjectOf(Label))->SetFocusControl(static_cast<TWinControl*>(ObjectOf(Find("Panel1"))));
  IPtr<IOTAComponent> Focus = Font;
  ASSERT_TRUE(Label->GetPropValueByName("FocusControl", &Focus));
  EXPECT_EQ(Focus, nullptr);
  static_cast<TLabel*>(ObjectOf(Label))->SetFocusControl(nullptr);
  Focus = Font;
  ASSERT_TRUE(Label->GetPropValueByName("FocusControl", &Focus));
  EXPECT_EQ(Focus, nullptr);
  // An object-valued property is not set through a wrapper: false, and no change heard.
  EXPECT_EQ(Label->GetPropTypeByName("FocusControl"), tkClass);
  EXPECT_FALSE(Label->SetPropByName("FocusControl", &Font));
  EXPECT_EQ(Heard.Count("W.Modified"), 0);
  Watcher->Leave();
}

//===----------------------------------------------------------------------===//
// Children, creation, selection, deletion
//===----------------------------------------------------------------------===//

TEST_F(FormEditorTest, ChildrenWalkedInStreamOrderAndACallbackStopsTheWalk) {
  IPtr<IOTAComponent> Form1 = Editor->GetRootComponent();
  std::vector<String> Names;
  auto Collect = [](void* Param, const IPtr<IOTAComponent>& Child, bool& Result) {
    String Name;
    Child->GetPropValueByName("Name", &Name);
    static_cast<std::vector<String>*>(Param)->push_back(Name);
    Result = Name != "Panel1";
  };
  // The callback clears Result at Panel1: the walk stops there by the silent exception.
  EXPECT_THROW(Form1->GetChildren(&Names, Collect), EAbort);
  EXPECT_EQ(Names, (std::vector<String>{"Button1", "Panel1"}));
  Names.clear();
  EXPECT_TRUE(Find("Panel1")->GetChildren(&Names, Collect));
  EXPECT_EQ(Names, std::vector<String>{"Button2"});
  // A second walk on the same wrapper works: the callback was let go.
  Names.clear();
  EXPECT_THROW(Form1->GetChildren(&Names, Collect), EAbort);
  EXPECT_EQ(Names.size(), 2u);
  EXPECT_THROW(Form1->GetChildren(nullptr, nullptr), EAbort) << "no callback: no walk";

  // The widget tree and the ownership.
  EXPECT_EQ(Form1->GetComponentCount(), 4);
  EXPECT_EQ(Form1->GetComponent(2)->GetComponentType(), "TButton");
  EXPECT_EQ(Form1->GetControlCount(), 3);
  EXPECT_EQ(ObjectOf(Form1->GetControl(1)), Form->GetRoot()->FindComponent("Panel1"));
  EXPECT_EQ(Form1->GetParent(), nullptr) << "the root component has no parent here";
  IPtr<IOTAComponent> Inner = Find("Button2");
  EXPECT_EQ(ObjectOf(Inner->GetParent()), Form->GetRoot()->FindComponent("Panel1"));
  EXPECT_TRUE(Inner->IsTControl());
  EXPECT_EQ(Inner->GetComponentCount(), 0);
  EXPECT_EQ(Inner->GetControlCount(), 0);
}

TEST_F(FormEditorTest, AComponentCreatedSelectedFocusedAndDeleted) {
  // Nothing selected: index 0 is the root component, index 1 nothing.
  Root->ClearSelection();
  EXPECT_EQ(Editor->GetSelCount(), 0);
  EXPECT_EQ(ObjectOf(Editor->GetSelComponent(0)), Form->GetRoot());
  EXPECT_EQ(Editor->GetSelComponent(1), nullptr);

  // Created in a container, at the bounds given.
  IPtr<IOTAComponent> Panel = Find("Panel1");
  IPtr<IOTAComponent> Made = Editor->CreateComponent(Panel, "TButton", 20, 10, 50, 22);
  ASSERT_TRUE(Made);
  auto* Button = static_cast<TButton*>(ObjectOf(Made));
  EXPECT_EQ(Button->Parent(), ObjectOf(Panel));
  EXPECT_EQ(Button->Owner(), Form->GetRoot());
  EXPECT_EQ(Button->BoundsRect(), (TRect{24, 8, 74, 30})) << "the corner snapped to the grid of 8, the size kept";
  // Without a container: on the form. Unknown and non-component classes give nothing.
  IPtr<IOTAComponent> OnForm = Editor->CreateComponent(nullptr, "TLabel", 5, 5, 30, 13);
  ASSERT_TRUE(OnForm);
  EXPECT_EQ(static_cast<TControl*>(ObjectOf(OnForm))->Parent(), Form->GetRoot());
  int Components = Form->GetRoot()->ComponentCount();
  EXPECT_EQ(Editor->CreateComponent(nullptr, "TNoSuchClass", 0, 0, 10, 10), nullptr);
  RegisterClass(TFont::StaticClass());
  auto Unregister = Finally([]() noexcept { UnRegisterClass(TFont::StaticClass()); });
  EXPECT_EQ(Editor->CreateComponent(nullptr, "TFont", 0, 0, 10, 10), nullptr);
  EXPECT_EQ(Form->GetRoot()->ComponentCount(), Components);

  // Selected, alone and added; the selection read back through the facade.
  EXPECT_TRUE(Made->Select(false));
  EXPECT_EQ(Editor->GetSelCount(), 1);
  EXPECT_EQ(ObjectOf(Editor->GetSelComponent(0)), Button);
  EXPECT_TRUE(Find("Button1")->Select(true));
  EXPECT_EQ(Editor->GetSelCount(), 2);
  EXPECT_EQ(ObjectOf(Editor->GetSelComponent(1)), Form->GetRoot()->FindComponent("Button1"));
  EXPECT_EQ(Editor->GetSelComponent(2), nullptr);
  EXPECT_EQ(ObjectOf(Editor->GetCreateParent()), Form->GetRoot());
  // Selecting the root component clears the selection.
  EXPECT_TRUE(Editor->GetRootComponent()->Select(true));
  EXPECT_EQ(Editor->GetSelCount(), 0);

  // Focus: with several selected the module is shown instead of an editor run.
  TCustomForm* Window = KilnRoot(Form)->DesignWindow();
  Made->Select(false);
  Window->Hide();
  Log.Clear();
  EXPECT_TRUE(Find("Button1")->Focus(true));
  EXPECT_EQ(Editor->GetSelCount(), 2);
  EXPECT_TRUE(Window->Visible());
  EXPECT_EQ(Log.Count("CreateMethod"), 0);
  // Alone, the item is edited: a button's editor makes its click handler.
  Window->Hide();
  EXPECT_TRUE(Find("Button1")->Focus(false));
  EXPECT_EQ(Editor->GetSelCount(), 1);
  EXPECT_EQ(Log.Count("CreateMethod"), 1);
  EXPECT_FALSE(Window->Visible());
  // On the root component: shown.
  EXPECT_TRUE(Editor->GetRootComponent()->Focus(false));
  EXPECT_TRUE(Window->Visible());

  // Deleted: only what the root component owns.
  EXPECT_FALSE(Editor->GetRootComponent()->Delete());
  TComponent* Owned = CreateComponent(TTimer::StaticClass(), Button);
  EXPECT_FALSE(Editor->GetComponentFromHandle(Owned)->Delete());
  EXPECT_EQ(Owned->Owner(), Button);
  Components = Form->GetRoot()->ComponentCount();
  EXPECT_TRUE(Made->Delete());
  EXPECT_EQ(Form->GetRoot()->FindComponent("Button3"), nullptr);
  EXPECT_EQ(Form->GetRoot()->ComponentCount(), Components - 1);
  EXPECT_EQ(Panel->GetControlCount(), 1);
}

//===----------------------------------------------------------------------===//
// Notifiers
//===----------------------------------------------------------------------===//

TEST_F(FormEditorTest, NotifiersCalledInOrderAndRemovedWithTheirHandlesUsedAgain) {
  auto A = New<TFormWatcher>("A", &Heard);
  auto B = New<TFormWatcher>("B", &Heard);
  auto C = New<TFormWatcher>("C", &Heard);
  auto Plain = New<TPlainWatcher>(&Heard);
  A->Join(Editor.Get());
  B->Join(Editor.Get());
  const int PlainHandle = Editor->AddNotifier(IPtr<IOTANotifier>(Plain.Get()));
  C->Join(Editor.Get());
  // A notifier that answers to neither notifier interface is skipped.
  IPtr<IInterfaceList> List = static_cast<TOTAFormEditor*>(Editor.Get())->NotifyList();
  const int Stranger = AddToList(List, IPtr<IInterface>(New<TInterfacedObject>().Get()));
  EXPECT_EQ((std::vector<int>{A->Handle, B->Handle, PlainHandle, C->Handle, Stranger}),
            (std::vector<int>{0, 1, 2, 3, 4}));

  // A change: every notifier in order; B leaves during the walk, which goes on.
  B->LeaveOnModified = true;
  Editor->MarkModified();
  EXPECT_EQ(Heard.Calls, (std::vector<String>{"A.Modified", "B.Modified", "Plain.Modified", "C.Modified"}));
  EXPECT_EQ(B->Handle, -1);
  Heard.Clear();
  Root->Modified();
  EXPECT_EQ(Heard.Calls, (std::vector<String>{"A.Modified", "Plain.Modified", "C.Modified"}));

  // The handle B left is the next one given, lowest first.
  auto D = New<TFormWatcher>("D", &Heard);
  D->Join(Editor.Get());
  EXPECT_EQ(D->Handle, 1);
  Editor->RemoveNotifier(Stranger);
  Editor->RemoveNotifier(A->Handle);
  auto E = New<TFormWatcher>("E", &Heard);
  E->Join(Editor.Get());
  EXPECT_EQ(E->Handle, 0);
  A->Handle = -1;

  // Saving, activation and renames reach the form notifiers only.
  Heard.Clear();
  QueryAs<IOTAEditorContent>(Editor)->GetContent();
  auto* Editor1 = static_cast<TOTAFormEditor*>(Editor.Get());
  Editor1->NotifyActivate();
  EXPECT_EQ(Heard.Calls, (std::vector<String>{"E.FormSaving", "D.FormSaving", "C.FormSaving", "E.FormActivated",
                                              "D.FormActivated", "C.FormActivated"}));
  Heard.Clear();
  Form->GetRoot()->FindComponent("Button1")->SetName("OkButton");
  EXPECT_EQ(Heard.Calls,
            (std::vector<String>{"E.ComponentRenamed(TButton,Button1,OkButton)",
                                 "D.ComponentRenamed(TButton,Button1,OkButton)",
                                 "C.ComponentRenamed(TButton,Button1,OkButton)"}));

  // The module goes: every notifier hears it, in order, and the form notifiers leave. The
  // plain one stays and hears it again when the facade itself goes.
  Heard.Clear();
  Editor = nullptr;
  Form->Close();
  Open.clear();
  Form = nullptr;
  EXPECT_EQ(Heard.Calls, (std::vector<String>{"E.Destroyed", "D.Destroyed", "Plain.Destroyed", "C.Destroyed",
                                              "Plain.Destroyed"}));
  EXPECT_EQ(C->Handle, -1);
}

TEST(NotifierList, ForEachSkipsEmptyEntriesAndANotifierOwnerReportsDanglingReferences) {
  TCallLog Heard;
  ForEach(nullptr, [&](const IPtr<IInterface>&, const IPtr<IInterface>&) { Heard.Add("called"); });
  IPtr<TOTAClass> Owner = New<TOTAClass>();
  ForEach(Owner->NotifyList(), nullptr);
  auto Plain = New<TPlainWatcher>(&Heard);
  EXPECT_EQ(AddToList(Owner->NotifyList(), IPtr<IInterface>(static_cast<IOTANotifier*>(Plain.Get()))), 0);
  EXPECT_EQ(AddToList(Owner->NotifyList(), nullptr), 1);
  EXPECT_EQ(AddToList(Owner->NotifyList(), IPtr<IInterface>(static_cast<IOTANotifier*>(Plain.Get()))), 1)
      << "an empty entry is taken first";
  Owner->NotifyList()->Put(0, nullptr);
  std::vector<int> Seen;
  ForEach(Owner->NotifyList(), [&](const IPtr<IInterface>& Item, const IPtr<IInterface>& Param) {
    Seen.push_back(Owner->NotifyList()->IndexOf(Item));
    EXPECT_EQ(Param.Get(), Owner->NotifyList().Get());
  }, Owner->NotifyList());
  EXPECT_EQ(Seen, std::vector<int>{1});
  EXPECT_EQ(Owner->GetInstance(), Owner.Get());

  // Freed while someone holds it: the notifiers are told, then the dangling count raises.
  TOTAClass* Raw = Owner.Get();
  try {
    Raw->Destroy();
    ADD_FAILURE() << "no exception";
  } catch (const Exception& E) {
    EXPECT_STREQ(E.what(), "Instance of Class TOTAClass has dangling reference count of 1");
  }
  EXPECT_EQ(Heard.Calls, std::vector<String>{"Plain.Destroyed"});
  // Let go, it is freed explicitly: the object's own reference goes with it.
  Owner = nullptr;
  Raw->Destroy();
  EXPECT_EQ(Heard.Calls, (std::vector<String>{"Plain.Destroyed", "Plain.Destroyed"}));
}

//===----------------------------------------------------------------------===//
// Content
//===----------------------------------------------------------------------===//

TEST_F(FormEditorTest, ContentReadAndSwappedLiveAndDormant) {
  auto Content1 = QueryAs<IOTAEditorContent>(Editor);
  String Original = Content();
  ASSERT_FALSE(Original.empty());
  auto Watcher = New<TFormWatcher>("W", &Heard);
  Watcher->Join(Editor.Get());

  // A change, then the old content put back on the live module.
  String Caption = "Changed";
  ASSERT_TRUE(Find("Button1")->SetPropByName("Caption", &Caption));
  String Changed = Content();
  EXPECT_NE(Changed, Original);
  Content1->ResetDiskAge();
  Heard.Clear();
  Content1->SetContent(HostStream(Original));
  EXPECT_FALSE(QueryAs<IInternalRoot>(Form)->IsDormant());
  EXPECT_EQ(static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"))->Caption(), "Go");
  EXPECT_EQ(Content(), Original);
  EXPECT_FALSE(Editor->GetModified()) << "the swap keeps the age of the content";
  EXPECT_EQ(Heard.Count("W.Modified"), 1) << "listeners hear of the swap";

  // A dormant module takes the content and stays dormant, telling nobody.
  Form->GoDormant();
  Heard.Clear();
  Content1->SetContent(HostStream(Changed));
  EXPECT_TRUE(QueryAs<IInternalRoot>(Form)->IsDormant());
  EXPECT_EQ(Heard.Calls, std::vector<String>{});
  EXPECT_EQ(Content(), Changed);
  QueryAs<IInternalRoot>(Form)->Resurrect();
  EXPECT_EQ(static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"))->Caption(), "Changed");

  // Content that does not load: the exception passes, the module is dormant on its old content.
  try {
    Content1->SetContent(HostStream("no form at all"));
    ADD_FAILURE() << "no exception";
  } catch (const EReadError& E) {
    EXPECT_STREQ(E.what(), "Invalid stream format");
  }
  EXPECT_TRUE(QueryAs<IInternalRoot>(Form)->IsDormant());
  EXPECT_EQ(Content(), Changed);
  // A stream that cannot be read: the same, with the stream's own message.
  try {
    Content1->SetContent(NewAs<IStream, TFailingStream>());
    ADD_FAILURE() << "no exception";
  } catch (const EStreamError& E) {
    EXPECT_STREQ(E.what(), "The host's stream failed");
  }
  EXPECT_TRUE(QueryAs<IInternalRoot>(Form)->IsDormant());
  EXPECT_EQ(Content(), Changed);
  Content1->SetContent(HostStream(Original));
  EXPECT_TRUE(QueryAs<IInternalRoot>(Form)->IsDormant());
  EXPECT_EQ(Content(), Original);
  QueryAs<IInternalRoot>(Form)->Resurrect();
  ASSERT_TRUE(Form->GetRoot());
  Watcher->Leave();
}

TEST_F(FormEditorTest, TheContentAgeIsTheModifyTimeAsAPackedLocalDate) {
  auto Content1 = QueryAs<IOTAEditorContent>(Editor);
  const char* OldZone = std::getenv("TZ");
  const String Zone = OldZone ? OldZone : "";
  setenv("TZ", "UTC", 1);
  tzset();
  auto RestoreZone = Finally([&]() noexcept {
    if (OldZone) setenv("TZ", Zone.c_str(), 1);
    else unsetenv("TZ");
    tzset();
  });
  // 2024-03-15 10:20:30, as a packed file date; the environment stamps the next change.
  const int Packed = static_cast<int>(((2024u - 1980u) << 25) | (3u << 21) | (15u << 16) | (10u << 11) |
                                      (20u << 5) | (30u / 2));
  Env->Timestamp = Packed - 1;
  Editor->MarkModified();
  ASSERT_EQ(Form->GetModifyTime(), Packed);
  EXPECT_EQ(Content1->GetContentAge(), EncodeDate(2024, 3, 15) + EncodeTime(10, 20, 30, 0));

  // No time (-1), or no valid date (month 0): the present time.
  for (int Stamp : {-1, 1001}) {
    Env->Timestamp = Stamp - 1;
    Editor->MarkModified();
    TDateTime Before = Now();
    TDateTime Age = Content1->GetContentAge();
    EXPECT_GE(Age, Before) << Stamp;
    EXPECT_LE(Age, Now()) << Stamp;
  }
}

//===----------------------------------------------------------------------===//
// The ancestor's module
//===----------------------------------------------------------------------===//

TEST_F(FormEditorTest, ADescendantForgetsItsAncestorWhenTheAncestorsModuleGoes) {
  IPtr<TRecordingModule> BaseModule;
  IPtr<IRoot> Base = OpenModule("Base", "", &BaseModule);
  IPtr<IRoot> Child = NewDescendant("Child", "Base");
  IPtr<IRoot> Other = NewDescendant("Other", "Base");
  ASSERT_TRUE(QueryAs<IInternalRoot>(Child)->GetAncestorRoot());
  // Each descendant watches the ancestor's module from its start.
  ASSERT_EQ(BaseModule->Notifiers->GetCount(), 2);
  EXPECT_TRUE(BaseModule->Notifiers->Get(0));
  EXPECT_EQ(Module->Notifiers->GetCount(), 0) << "a module of its own watches nothing";

  // A descendant that closes stops watching; its handle is free again.
  Other->Close();
  Open.pop_back();
  Other = nullptr;
  EXPECT_EQ(BaseModule->Notifiers->Get(1), nullptr);

  // The ancestor's module goes: the descendant has no ancestor root and no master any more.
  BaseModule->TellDestroyed();
  EXPECT_EQ(BaseModule->Notifiers->Get(0), nullptr);
  EXPECT_EQ(QueryAs<IInternalRoot>(Child)->GetAncestorRoot(), nullptr);
  EXPECT_EQ(QueryAs<IInternalRoot>(Child)->GetMasterView(), nullptr);

  // The notifier on its own: registered only where there is an ancestor, told once.
  auto* ChildRoot = static_cast<TComponentRoot*>(QueryAs<IInternalRoot>(Child)->Implementor());
  EXPECT_EQ(New<TAncestorNotifier>(ChildRoot)->NotifierIndex(), -1) << "the ancestor is gone";
  EXPECT_EQ(New<TAncestorNotifier>()->NotifierIndex(), -1);
  IPtr<IRoot> Late = NewDescendant("Late", "Base");
  auto* LateRoot = static_cast<TComponentRoot*>(QueryAs<IInternalRoot>(Late)->Implementor());
  IPtr<TAncestorNotifier> Watch = New<TAncestorNotifier>(LateRoot);
  EXPECT_EQ(Watch->NotifierIndex(), 1) << "the lowest free handle after the root's own";
  EXPECT_TRUE(Watch->CheckOverwrite());
  Watch->Destroyed();
  EXPECT_EQ(Watch->NotifierIndex(), -1);
  EXPECT_EQ(QueryAs<IInternalRoot>(Late)->GetAncestorRoot(), nullptr);
  Watch->Destroyed(); // again: nothing left to do
  EXPECT_EQ(BaseModule->Notifiers->Get(1), nullptr);
}

//===----------------------------------------------------------------------===//
// Platforms and artwork
//===----------------------------------------------------------------------===//

TEST(ToolUtils, PlatformsMatchByThePlatformRulesAndArtworkUnmasksBothWays) {
  for (const char* B : {"OSX32", "OSX64", "OSXARM64", "iOSSimARM64", "iOSDevice32", "iOSDevice64"}) {
    EXPECT_TRUE(PlatformMatch("OSX64", B)) << B;
    EXPECT_EQ(SDKPlatformMatch("OSX64", B), String(B) == "OSX64") << B;
  }
  EXPECT_FALSE(PlatformMatch("OSX64", "osx64")) << "exact comparison";
  EXPECT_FALSE(PlatformMatch("OSX64", "Win64"));
  EXPECT_FALSE(PlatformMatch("OSXARM64", "OSX64")) << "the rule goes one way";
  for (auto Match : {&PlatformMatch, &SDKPlatformMatch}) {
    EXPECT_TRUE(Match("Win64", "Win64"));
    EXPECT_TRUE(Match("Win64", "Win64x"));
    EXPECT_FALSE(Match("Win64x", "Win64"));
    EXPECT_FALSE(Match("Win64", "Win32"));
    EXPECT_TRUE(Match("Linux64", "Linux64"));
    EXPECT_FALSE(Match("Linux64", "Win64"));
    EXPECT_TRUE(Match("", ""));
  }

  TMemoryStream Plain, Masked, Back;
  const String Art = "device frame\x00\xff\x5a"s;
  Plain.WriteBuffer(Art.data(), static_cast<std::int64_t>(Art.size()));
  Plain.SetPosition(0);
  DecryptDeviceArtWork(&Plain, &Masked);
  EXPECT_EQ(Masked.Position(), 0);
  EXPECT_EQ(Masked.Size(), static_cast<std::int64_t>(Art.size()));
  EXPECT_EQ(Masked.Memory()[0], static_cast<std::uint8_t>('d' ^ DeviceArtWorkMask));
  EXPECT_EQ(Masked.Memory()[Art.size() - 1], 0);
  DecryptDeviceArtWork(&Masked, &Back);
  EXPECT_EQ(String(reinterpret_cast<const char*>(Back.Memory()), static_cast<std::size_t>(Back.Size())), Art);
}

} // namespace
