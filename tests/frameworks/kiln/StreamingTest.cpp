//===- tests/frameworks/kiln/StreamingTest.cpp - Forms through form files -===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

/// A program's form: its event handlers are published methods.
class TMainForm : public TForm {
  FK_CLASS(TMainForm, TForm)
  void ButtonClick(TObject*) {}
  void Tick(TObject*) {}
};
FK_IMPLEMENT(TMainForm, "StreamingTest") {
  B.Method<&TMainForm::ButtonClick>("ButtonClick");
  B.Method<&TMainForm::Tick>("Tick");
}

class TSampleFrame : public TFrame {
  FK_CLASS(TSampleFrame, TFrame)
};
FK_IMPLEMENT(TSampleFrame, "StreamingTest") {}

class TSampleModule : public TDataModule {
  FK_CLASS(TSampleModule, TDataModule)
};
FK_IMPLEMENT(TSampleModule, "StreamingTest") {}

class KilnStreaming : public KilnTest {
protected:
  void SetUp() override {
    KilnTest::SetUp();
    RegisterClasses({TMainForm::StaticClass(), TSampleFrame::StaticClass(), TSampleModule::StaticClass()});
  }
  void TearDown() override {
    UnRegisterClass(TMainForm::StaticClass());
    UnRegisterClass(TSampleFrame::StaticClass());
    UnRegisterClass(TSampleModule::StaticClass());
    KilnTest::TearDown();
  }
};

std::vector<std::uint8_t> WriteBytes(TComponent* Root, TComponent* Ancestor = nullptr) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, Ancestor);
    W->FlushBuffer();
  }
  return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
}

String ToText(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectBinaryToText(In.Get(), Out.Get());
  return String(reinterpret_cast<const char*>(Out->Memory()), static_cast<std::size_t>(Out->Size()));
}

std::vector<std::uint8_t> ToBinary(const String& Text) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Text.data(), Text.size()));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectTextToBinary(In.Get(), Out.Get());
  return std::vector<std::uint8_t>(Out->Memory(), Out->Memory() + Out->Size());
}

/// Reads `Bytes` into `Root`, a fresh instance.
template <class T> T* ReadInto(const std::vector<std::uint8_t>& Bytes, T* Root) {
  TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(S.Get(), 4096));
  R->ReadRootComponent(Root);
  return Root;
}

/// The sample: a form with a panel holding two buttons, a label, an edit, a check box
/// and a timer.
TMainForm* BuildSample() {
  auto* Form = CreateComponentOf<TMainForm>(nullptr);
  Form->SetName("Form1");
  Form->SetClientWidth(400);
  Form->SetClientHeight(250);
  auto* Panel = Make<TPanel>(Form, Form, "Panel1");
  Panel->SetBounds(8, 8, 200, 80);
  Panel->SetCaption("");
  Panel->SetBevelOuter(bvLowered);
  auto* B1 = Make<TButton>(Form, Panel, "Button1");
  B1->SetBounds(8, 8, 75, 25);
  B1->OnClick = TNotifyEvent::Bind<&TMainForm::ButtonClick>(Form);
  auto* B2 = Make<TButton>(Form, Panel, "Button2");
  B2->SetBounds(96, 8, 75, 25);
  B2->SetCaption("Cancel");
  B2->SetCancel(true);
  auto* Label = Make<TLabel>(Form, Form, "Label1");
  Label->SetBounds(8, 96, 65, 17);
  Label->SetCaption("Name:");
  Label->Font()->SetStyle({fsBold});
  auto* Edit = Make<TEdit>(Form, Form, "Edit1");
  Edit->SetBounds(80, 96, 121, 23);
  Edit->SetText("");
  auto* Check = Make<TCheckBox>(Form, Form, "CheckBox1");
  Check->SetBounds(8, 128, 97, 19);
  Check->SetChecked(true);
  Check->SetHint("Remember");
  auto* Timer = Make<TTimer>(Form, nullptr, "Timer1");
  Timer->SetInterval(250);
  Timer->OnTimer = TNotifyEvent::Bind<&TMainForm::Tick>(Form);
  Timer->SetDesignInfo((200 << 16) | 300);
  return Form;
}

const char* const SampleText =
    "object Form1: TMainForm\n"
    "  Left = 0\n"
    "  Top = 0\n"
    "  Caption = \"Form1\"\n"
    "  ClientHeight = 250\n"
    "  ClientWidth = 400\n"
    "  PixelsPerInch = 96\n"
    "  object Panel1: TPanel\n"
    "    Left = 8\n"
    "    Top = 8\n"
    "    Width = 200\n"
    "    Height = 80\n"
    "    BevelOuter = bvLowered\n"
    "    TabOrder = 0\n"
    "    object Button1: TButton\n"
    "      Left = 8\n"
    "      Top = 8\n"
    "      Width = 75\n"
    "      Height = 25\n"
    "      Caption = \"Button1\"\n"
    "      TabOrder = 0\n"
    "      OnClick = ButtonClick\n"
    "    end\n"
    "    object Button2: TButton\n"
    "      Left = 96\n"
    "      Top = 8\n"
    "      Width = 75\n"
    "      Height = 25\n"
    "      Cancel = True\n"
    "      Caption = \"Cancel\"\n"
    "      TabOrder = 1\n"
    "    end\n"
    "  end\n"
    "  object Label1: TLabel\n"
    "    Left = 8\n"
    "    Top = 96\n"
    "    Width = 65\n"
    "    Height = 17\n"
    "    Caption = \"Name:\"\n"
    "    Font.Style = [fsBold]\n"
    "    ParentFont = False\n"
    "  end\n"
    "  object Edit1: TEdit\n"
    "    Left = 80\n"
    "    Top = 96\n"
    "    Width = 121\n"
    "    Height = 23\n"
    "    TabOrder = 1\n"
    "  end\n"
    "  object CheckBox1: TCheckBox\n"
    "    Left = 8\n"
    "    Top = 128\n"
    "    Width = 97\n"
    "    Height = 19\n"
    "    Hint = \"Remember\"\n"
    "    Caption = \"CheckBox1\"\n"
    "    Checked = True\n"
    "    TabOrder = 2\n"
    "  end\n"
    "  object Timer1: TTimer\n"
    "    Interval = 250\n"
    "    OnTimer = Tick\n"
    "    Left = 300\n"
    "    Top = 200\n"
    "  end\n"
    "end\n";

TEST_F(KilnStreaming, ASmallFormHasThisText) {
  TRootGuard<TMainForm> Form(BuildSample());
  EXPECT_EQ(ToText(WriteBytes(Form.P)), SampleText);
}

TEST_F(KilnStreaming, BinaryAndTextRoundTrip) {
  TRootGuard<TMainForm> Form(BuildSample());
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  EXPECT_EQ(ToBinary(ToText(Bytes)), Bytes) << "text converts back to the same bytes";

  TRootGuard<TMainForm> Copy(ReadInto(Bytes, CreateComponentOf<TMainForm>(nullptr)));
  EXPECT_EQ(WriteBytes(Copy.P), Bytes);
  // The tree came back with its parents, bounds, state and handlers.
  auto* Panel = static_cast<TPanel*>(Copy->FindComponent("Panel1"));
  auto* B2 = static_cast<TButton*>(Copy->FindComponent("Button2"));
  auto* Edit = static_cast<TEdit*>(Copy->FindComponent("Edit1"));
  auto* Timer = static_cast<TTimer*>(Copy->FindComponent("Timer1"));
  ASSERT_TRUE(Panel && B2 && Edit && Timer);
  EXPECT_EQ(Copy->ControlCount(), 4);
  EXPECT_EQ(Panel->ControlCount(), 2);
  EXPECT_EQ(B2->Parent(), Panel);
  EXPECT_EQ(B2->BoundsRect(), Rect(96, 8, 171, 33));
  EXPECT_EQ(B2->TabOrder(), 1);
  EXPECT_EQ(Edit->Text(), "") << "an emptied text does not come back as the name";
  EXPECT_EQ(Panel->Caption(), "");
  EXPECT_TRUE(static_cast<TCheckBox*>(Copy->FindComponent("CheckBox1"))->Checked());
  EXPECT_TRUE(static_cast<TLabel*>(Copy->FindComponent("Label1"))->Font()->Style().Contains(fsBold));
  EXPECT_EQ(Timer->Interval(), 250);
  EXPECT_EQ(Timer->DesignInfo(), (200 << 16) | 300);
  EXPECT_EQ(Copy->ClientWidth(), 400);
  EXPECT_EQ(Copy->MethodName(static_cast<TButton*>(Copy->FindComponent("Button1"))->OnClick.Method().Code),
            "ButtonClick");

  // And from the text form.
  TRootGuard<TMainForm> FromText(ReadInto(ToBinary(SampleText), CreateComponentOf<TMainForm>(nullptr)));
  EXPECT_EQ(ToText(WriteBytes(FromText.P)), SampleText);
}

TEST_F(KilnStreaming, ADescendantWritesOnlyItsDifferences) {
  TRootGuard<TMainForm> Ancestor(BuildSample());
  std::vector<std::uint8_t> Bytes = WriteBytes(Ancestor.P);
  TRootGuard<TMainForm> Form(ReadInto(Bytes, CreateComponentOf<TMainForm>(nullptr)));
  EXPECT_EQ(ToText(WriteBytes(Form.P, Ancestor.P)),
            "inherited Form1: TMainForm\n"
            "  inherited Panel1: TPanel\n"
            "    inherited Button1: TButton\n"
            "    end\n"
            "    inherited Button2: TButton\n"
            "    end\n"
            "  end\n"
            "  inherited Label1: TLabel\n"
            "  end\n"
            "  inherited Edit1: TEdit\n"
            "  end\n"
            "  inherited CheckBox1: TCheckBox\n"
            "  end\n"
            "  inherited Timer1: TTimer\n"
            "  end\n"
            "end\n");

  auto* B1 = static_cast<TButton*>(Form->FindComponent("Button1"));
  B1->SetLeft(20);
  auto* B3 = Make<TButton>(Form.P, static_cast<TPanel*>(Form->FindComponent("Panel1")), "Button3");
  B3->SetBounds(8, 40, 75, 25);
  Form->Font()->SetSize(11);
  EXPECT_EQ(ToText(WriteBytes(Form.P, Ancestor.P)),
            "inherited Form1: TMainForm\n"
            "  Font.Size = 11\n"
            "  inherited Panel1: TPanel\n"
            "    inherited Button1: TButton\n"
            "      Left = 20\n"
            "    end\n"
            "    inherited Button2: TButton\n"
            "    end\n"
            "    object Button3: TButton\n"
            "      Left = 8\n"
            "      Top = 40\n"
            "      Width = 75\n"
            "      Height = 25\n"
            "      Caption = \"Button3\"\n"
            "      TabOrder = 2\n"
            "    end\n"
            "  end\n"
            "  inherited Label1: TLabel\n"
            "  end\n"
            "  inherited Edit1: TEdit\n"
            "  end\n"
            "  inherited CheckBox1: TCheckBox\n"
            "  end\n"
            "  inherited Timer1: TTimer\n"
            "  end\n"
            "end\n");
}

TEST_F(KilnStreaming, ChildOrderComesBack) {
  TRootGuard<TMainForm> Form(BuildSample());
  auto* Panel = static_cast<TPanel*>(Form->FindComponent("Panel1"));
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  TRootGuard<TMainForm> Copy(ReadInto(Bytes, CreateComponentOf<TMainForm>(nullptr)));
  // Button2 goes under Button1 in the descendant: the stream says where it stands.
  auto* CopyPanel = static_cast<TPanel*>(Copy->FindComponent("Panel1"));
  CopyPanel->SendToBack(static_cast<TControl*>(Copy->FindComponent("Button2")));
  std::vector<std::uint8_t> Diff = WriteBytes(Copy.P, Form.P);
  EXPECT_NE(ToText(Diff).find("inherited Button2: TButton [0]\n"), String::npos) << ToText(Diff);
  // Read the difference over a fresh copy of the ancestor.
  TRootGuard<TMainForm> Again(ReadInto(Bytes, CreateComponentOf<TMainForm>(nullptr)));
  ReadInto(Diff, Again.P);
  auto* AgainPanel = static_cast<TPanel*>(Again->FindComponent("Panel1"));
  EXPECT_EQ(AgainPanel->Controls(0)->Name(), "Button2");
  EXPECT_EQ(AgainPanel->Controls(1)->Name(), "Button1");
  EXPECT_EQ(Panel->Controls(0)->Name(), "Button1");
}

TEST_F(KilnStreaming, AStatusBarsPanelsAreItemsOfOneProperty) {
  TRootGuard<TMainForm> Form(CreateComponentOf<TMainForm>(nullptr));
  Form->SetName("Form1");
  Form->SetClientWidth(300);
  auto* Bar = Make<TStatusBar>(Form.P, Form.P, "StatusBar1");
  EXPECT_EQ(Bar->Align(), alBottom);
  EXPECT_EQ(Bar->Height(), 19);
  Bar->Panels()->Add()->SetText("Ready");
  TStatusPanel* Second = Bar->Panels()->Add();
  Second->SetWidth(80);
  EXPECT_EQ(Second->GetDisplayName(), "TStatusPanel");
  try {
    Second->SetWidth(-1);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "Panel width -1 is not valid: it must be 0 or more");
  }
  EXPECT_EQ(Second->Width(), 80);
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  String Text = ToText(Bytes);
  EXPECT_NE(Text.find("  object StatusBar1: TStatusBar\n"), String::npos) << Text;
  EXPECT_NE(Text.find("    Panels = <\n"
                      "      item\n"
                      "        Text = \"Ready\"\n"
                      "      end\n"
                      "      item\n"
                      "        Width = 80\n"
                      "      end\n"
                      "    >\n"),
            String::npos)
      << Text;
  TRootGuard<TMainForm> Copy(ReadInto(Bytes, CreateComponentOf<TMainForm>(nullptr)));
  auto* CopyBar = static_cast<TStatusBar*>(Copy->FindComponent("StatusBar1"));
  ASSERT_EQ(CopyBar->Panels()->Count(), 2);
  EXPECT_EQ(CopyBar->Panels()->Items(0)->Text(), "Ready");
  EXPECT_EQ(CopyBar->Panels()->Items(1)->Width(), 80);
  // Drawn cell by cell, the last one to the end of the bar.
  TObjectGuard<TCanvas> Canvas(new TCanvas);
  CopyBar->Paint(Canvas.Get());
  std::vector<String> Texts;
  for (const String& Line : Canvas->Lines())
    if (Line.rfind("TextRect", 0) == 0) Texts.push_back(Line);
  EXPECT_EQ(Texts, (std::vector<String>{"TextRect(0,0,50,19,2,2,\"Ready\")", "TextRect(51,0,300,19,53,2,\"\")"}));
}

TEST_F(KilnStreaming, FramesAndDataModulesAreRoots) {
  TRootGuard<TSampleFrame> Frame(CreateComponentOf<TSampleFrame>(nullptr));
  Frame->SetName("Frame1");
  Make<TButton>(Frame.P, Frame.P, "Button1");
  Make<TTimer>(Frame.P, nullptr, "Timer1");
  EXPECT_EQ(ToText(WriteBytes(Frame.P)),
            "object Frame1: TSampleFrame\n"
            "  Left = 0\n"
            "  Top = 0\n"
            "  Width = 320\n"
            "  Height = 240\n"
            "  object Button1: TButton\n"
            "    Left = 0\n"
            "    Top = 0\n"
            "    Width = 75\n"
            "    Height = 25\n"
            "    Caption = \"Button1\"\n"
            "    TabOrder = 0\n"
            "  end\n"
            "  object Timer1: TTimer\n"
            "  end\n"
            "end\n");

  TRootGuard<TSampleModule> Module(CreateComponentOf<TSampleModule>(nullptr));
  Module->SetName("DataModule1");
  Module->SetDesignSize(Point(300, 200));
  Module->SetDesignPPI(96);
  Module->SetDesignInfo((10 << 16) | static_cast<std::uint16_t>(-5));
  Make<TTimer>(Module.P, nullptr, "Timer1")->SetEnabled(false);
  const char* ModuleText =
      "object DataModule1: TSampleModule\n"
      "  Left = -5\n"
      "  Top = 10\n"
      "  Height = 200\n"
      "  Width = 300\n"
      "  PixelsPerInch = 96\n"
      "  object Timer1: TTimer\n"
      "    Enabled = False\n"
      "  end\n"
      "end\n";
  std::vector<std::uint8_t> Bytes = WriteBytes(Module.P);
  EXPECT_EQ(ToText(Bytes), ModuleText);
  TRootGuard<TSampleModule> Copy(ReadInto(Bytes, CreateComponentOf<TSampleModule>(nullptr)));
  EXPECT_EQ(Copy->DesignSize(), Point(300, 200));
  EXPECT_EQ(Copy->DesignPPI(), 96);
  EXPECT_EQ(ToText(WriteBytes(Copy.P)), ModuleText);
}

TEST_F(KilnStreaming, ClassesAreFoundInTheFrameworksGroup) {
  EXPECT_EQ(GetClass("TButton"), TButton::StaticClass());
  EXPECT_EQ(ClassGroupOf(TButton::StaticClass()), TControl::StaticClass());
  EXPECT_EQ(ClassGroupOf(TTimer::StaticClass()), TControl::StaticClass());
  EXPECT_EQ(ClassGroupOf(TDataModule::StaticClass()), TControl::StaticClass());
  EXPECT_EQ(CurrentClassGroup(), TControl::StaticClass());
  InitializeKiln(); // nested: nothing changes
  FinalizeKiln();
  EXPECT_TRUE(KilnInitialized());
  EXPECT_EQ(GetClass("TPanel"), TPanel::StaticClass());
}

TEST(KilnStart, StopUndoesTheStart) {
  TClass Before = CurrentClassGroup();
  InitializeKiln();
  EXPECT_EQ(GetClass("TForm"), TForm::StaticClass());
  FinalizeKiln();
  EXPECT_FALSE(KilnInitialized());
  EXPECT_EQ(GetClass("TForm"), nullptr);
  EXPECT_EQ(CurrentClassGroup(), Before);
}

} // namespace
