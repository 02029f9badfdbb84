//===- tests/frameworks/kiln/FormsAtScaleTest.cpp - Big forms, failed reads ===//
//
// A parent with more children than a 16-bit position holds saves and reopens;
// tab positions stay right as children come and go; a read that fails inside a
// new container frees the container but not the inherited control it adopted.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

class KilnAtScale : public KilnTest {};

std::vector<std::uint8_t> Save(TComponent* Root) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, nullptr);
    W->FlushBuffer();
  }
  return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
}

template <class T> T* Open(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(S.Get(), 4096));
  return static_cast<T*>(R->ReadRootComponent(CreateComponentOf<T>(nullptr)));
}

std::vector<std::uint8_t> FromText(const String& Text) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Text.data(), Text.size()));
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  ObjectTextToBinary(In.Get(), Bin.Get());
  return std::vector<std::uint8_t>(Bin->Memory(), Bin->Memory() + Bin->Size());
}

std::vector<std::uint8_t> ThroughText(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  ObjectBinaryToText(In.Get(), Text.Get());
  Text->SetPosition(0);
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectTextToBinary(Text.Get(), Out.Get());
  return std::vector<std::uint8_t>(Out->Memory(), Out->Memory() + Out->Size());
}

} // namespace

TEST_F(KilnAtScale, AParentOfMoreThan32767ChildrenSavesAndReopens) {
  constexpr int Count = 33000;
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  for (int I = 0; I < Count; ++I) Make<TButton>(Form.P, Form.P, "Button" + std::to_string(I));
  std::vector<std::uint8_t> Bytes = Save(Form.P);
  for (const auto& Copy : {Bytes, ThroughText(Bytes)}) {
    TRootGuard<TForm> Again(Open<TForm>(Copy));
    ASSERT_EQ(Count, Again->ControlCount());
    auto* Last = static_cast<TButton*>(Again->FindComponent("Button32999"));
    ASSERT_NE(nullptr, Last);
    EXPECT_EQ(32999, Last->TabOrder());
    EXPECT_EQ(Bytes, Save(Again.P));
  }
}

TEST_F(KilnAtScale, TabPositionsFollowMovesAndRemovals) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  std::vector<TButton*> B;
  for (int I = 0; I < 5; ++I) B.push_back(Make<TButton>(Form.P, Form.P, "B" + std::to_string(I)));
  B[4]->SetTabOrder(0);   // 4 0 1 2 3
  B[1]->Destroy();        // 4 0 2 3
  B[0]->SetTabOrder(99);  // 4 2 3 0: clamped to the end
  EXPECT_EQ(0, B[4]->TabOrder());
  EXPECT_EQ(1, B[2]->TabOrder());
  EXPECT_EQ(2, B[3]->TabOrder());
  EXPECT_EQ(3, B[0]->TabOrder());
  B[2]->SetParent(nullptr);
  EXPECT_EQ(-1, B[2]->TabOrder());
  EXPECT_EQ(1, B[3]->TabOrder());
  B[2]->SetTabOrder(0); // kept until it has a parent again
  B[2]->SetParent(Form.P);
  EXPECT_EQ(0, B[2]->TabOrder());
  EXPECT_EQ(1, B[4]->TabOrder());
}

TEST_F(KilnAtScale, AFailedReadInsideANewContainerKeepsTheAdoptedControl) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  auto* Button0 = Make<TButton>(Form.P, Form.P, "Button0");
  Button0->SetLeft(3);
  const String Text = "object Form1: TForm\n"
                      "  object Panel1: TPanel\n"
                      "    inherited Button0: TButton\n"
                      "      Left = 5\n"
                      "    end\n"
                      "    object Bad1: TNoSuchControl\n"
                      "    end\n"
                      "  end\n"
                      "end\n";
  TObjectGuard<TBytesStream> Bin(new TBytesStream(FromText(Text)));
  TObjectGuard<TReader> R(new TReader(Bin.Get(), 4096));
  try {
    R->ReadRootComponent(Form.P);
    FAIL() << "the unknown class must fail the read";
  } catch (const EReadError& E) {
    EXPECT_STREQ("Class TNoSuchControl not found", E.what());
  }
  // The panel is gone; the control it adopted is back on the form, whole.
  EXPECT_EQ(nullptr, Form->FindComponent("Panel1"));
  ASSERT_EQ(Button0, Form->FindComponent("Button0"));
  EXPECT_EQ(Form.P, Button0->Parent());
  EXPECT_EQ(1, Form->ControlCount());
  EXPECT_FALSE(Button0->ComponentState().Contains(csLoading));
  EXPECT_FALSE(Button0->ComponentState().Contains(csReading));
}

TEST_F(KilnAtScale, FreeingNestedFormsBuiltInAnyOrderLeavesNothing) {
  // Children owned by the form, parented to panels, created after all panels and in an
  // order unrelated to their panels: the form's teardown frees each once.
  TForm* Form = CreateComponentOf<TForm>(nullptr);
  std::vector<TPanel*> Panels;
  for (int P = 0; P < 20; ++P) Panels.push_back(Make<TPanel>(Form, P ? Panels[P / 2] : static_cast<TWinControl*>(Form), "P" + std::to_string(P)));
  for (int I = 0; I < 400; ++I) Make<TButton>(Form, Panels[(I * 7) % 20], "B" + std::to_string(I));
  Panels[3]->Destroy(); // takes its children and nested panels, whoever owns them
  EXPECT_EQ(nullptr, Form->FindComponent("P3"));
  EXPECT_EQ(nullptr, Form->FindComponent("P7"));
  Form->Destroy();
}

TEST_F(KilnAtScale, ALabelsFocusControlStreamsByNameAndClearsWhenItGoes) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  auto* Label = Make<TLabel>(Form.P, Form.P, "Label1");
  auto* Edit = Make<TEdit>(Form.P, Form.P, "Edit1");
  Label->SetFocusControl(Edit);
  TRootGuard<TForm> Again(Open<TForm>(Save(Form.P)));
  auto* Read = static_cast<TLabel*>(Again->FindComponent("Label1"));
  EXPECT_EQ(Again->FindComponent("Edit1"), Read->FocusControl());
  Edit->Destroy();
  EXPECT_EQ(nullptr, Label->FocusControl());
  // Across owners the link holds too.
  TRootGuard<TForm> Other(CreateComponentOf<TForm>(nullptr));
  auto* Far = Make<TEdit>(Other.P, Other.P, "Far1");
  Label->SetFocusControl(Far);
  Other.P->Destroy();
  Other.P = nullptr;
  EXPECT_EQ(nullptr, Label->FocusControl());
}

TEST_F(KilnAtScale, TabPositionsReadApplyOnceAllSiblingsAreThere) {
  // Written in this order, the tab order is Edit2, Edit1, Button1: each position only makes
  // sense among all three, so it cannot be applied as each child arrives.
  const String Text = "object Form1: TForm\n"
                      "  object Button1: TButton\n"
                      "    TabOrder = 2\n"
                      "  end\n"
                      "  object Edit1: TEdit\n"
                      "    TabOrder = 1\n"
                      "  end\n"
                      "  object Edit2: TEdit\n"
                      "    TabOrder = 0\n"
                      "  end\n"
                      "end\n";
  TRootGuard<TForm> Form(Open<TForm>(FromText(Text)));
  EXPECT_EQ(2, static_cast<TWinControl*>(Form->FindComponent("Button1"))->TabOrder());
  EXPECT_EQ(1, static_cast<TWinControl*>(Form->FindComponent("Edit1"))->TabOrder());
  EXPECT_EQ(0, static_cast<TWinControl*>(Form->FindComponent("Edit2"))->TabOrder());
  // Saved and reopened, the order stays.
  std::vector<std::uint8_t> Saved = Save(Form.P);
  TRootGuard<TForm> Again(Open<TForm>(Saved));
  EXPECT_EQ(Saved, Save(Again.P));
}

TEST_F(KilnAtScale, AControlReadUnderANonVisualComponentIsRefusedAndKeepsItsParent) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  auto* Edit = Make<TEdit>(Form.P, Form.P, "Edit1");
  Make<TTimer>(Form.P, nullptr, "Timer1");
  // Edit1 would be left without a parent, and written back under the form.
  TObjectGuard<TBytesStream> Bin(new TBytesStream(FromText("object Form1: TForm\n"
                                                           "  inherited Timer1: TTimer\n"
                                                           "    inherited Edit1: TEdit\n"
                                                           "    end\n"
                                                           "  end\n"
                                                           "end\n")));
  TObjectGuard<TReader> R(new TReader(Bin.Get(), 4096));
  try {
    R->ReadRootComponent(Form.P);
    FAIL() << "a control stood under a timer";
  } catch (const EReadError& E) {
    EXPECT_STREQ("Component 'Timer1' cannot hold the control 'Edit1'", E.what());
  }
  EXPECT_EQ(Form.P, Edit->Parent());
}
