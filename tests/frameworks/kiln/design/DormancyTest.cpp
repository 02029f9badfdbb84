//===- tests/frameworks/kiln/design/DormancyTest.cpp - Modules kept as their stream ===//
//
// A Kiln module that goes dormant keeps its name, its file and its stream and
// stays in the designer's list; it comes back from that stream as it was, and a
// failed return leaves it dormant with the same stream to try again.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "platform/Filer.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A button class a test can take away from the class registry.
class TRareButton : public TButton {
  FK_CLASS(TRareButton, TButton)
};
FK_IMPLEMENT(TRareButton, "DormancyTest") {}

struct DormancyTest : KilnDesignFixture {
  IPtr<IRoot> Form;
  IPtr<TRecordingModule> Module;
  void SetUp() override {
    KilnDesignFixture::SetUp();
    Form = NewForm("Form1", &Module);
    TKilnRoot* Kiln = KilnRoot(Form);
    auto* Button = static_cast<TButton*>(Kiln->CreateComponent(TButton::StaticClass(), Form->GetRoot(), 8, 8, 75, 25));
    Button->SetCaption("Go");
    Kiln->CreateComponent(TPanel::StaticClass(), Form->GetRoot(), 8, 48, 185, 41);
  }
  void TearDown() override {
    Form = nullptr;
    Module = nullptr;
    KilnDesignFixture::TearDown();
  }
  static std::vector<std::uint8_t> BytesOf(const IPtr<IDatedStream>& S) {
    std::vector<std::uint8_t> Bytes;
    std::uint8_t Buffer[4096];
    for (std::int64_t N; (N = S->Read(Buffer, sizeof Buffer)) > 0;) Bytes.insert(Bytes.end(), Buffer, Buffer + N);
    return Bytes;
  }
};

TEST_F(DormancyTest, ADormantModuleKeepsItsNameAndStreamAndComesBackAsItWas) {
  auto Internal = QueryAs<IInternalRoot>(Form);
  String Image = FormImage(Form->GetRoot());
  std::vector<std::uint8_t> Live = BytesOf(Form->FormFileOpen());
  int Roots = Designer->GetRootsCount();
  Form->GoDormant();
  EXPECT_TRUE(Internal->IsDormant());
  EXPECT_EQ(Form->GetRoot(), nullptr);
  EXPECT_EQ(Form->GetRootName(), "Form1");
  EXPECT_EQ(Designer->GetRootsCount(), Roots);
  // The host still reads its stream: a copy, the same bytes.
  EXPECT_EQ(BytesOf(Form->FormFileOpen()), Live);
  EXPECT_TRUE(Internal->IsDormant());

  Log.Clear();
  Internal->Resurrect();
  EXPECT_FALSE(Internal->IsDormant());
  ASSERT_NE(Form->GetRoot(), nullptr);
  EXPECT_EQ(Form->GetRootName(), "Form1");
  EXPECT_EQ(FormImage(Form->GetRoot()), Image);
  EXPECT_EQ(Form->GetModifyTime(), Form->GetTimeAtLoad()) << "a clean return is unmodified";
  EXPECT_EQ(Log.Count("ModuleResurrected"), 1);
  // Again on a live module: nothing changes.
  TComponent* Root = Form->GetRoot();
  Internal->Resurrect();
  EXPECT_EQ(Form->GetRoot(), Root);
  // Asking for the design class brings a dormant module back.
  Form->GoDormant();
  KilnRoot(Form)->GetDesignClassName();
  EXPECT_NE(Form->GetRoot(), nullptr);
}

TEST_F(DormancyTest, AnAncestorWithHandlersSleepsAndWakesAndItsDescendantStillFollowsIt) {
  auto* Button = static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"));
  Button->OnClick = TNotifyEvent(QueryAs<IDesigner>(Form)->CreateMethod("Button1Click", IPtr<IEventInfo>()));
  KilnRoot(Form)->Modified();
  IPtr<IRoot> Heir = NewDescendant("Form2", "Form1");
  std::vector<std::uint8_t> Stream = BytesOf(Form->FormFileOpen());

  Form->GoDormant();
  ASSERT_NE(Heir->GetRoot(), nullptr) << "the descendant stays open";
  QueryAs<IInternalRoot>(Form)->Resurrect();
  EXPECT_EQ(BytesOf(Form->FormFileOpen()), Stream);
  Button = static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"));
  ASSERT_NE(Button, nullptr);
  EXPECT_EQ(QueryAs<IDesigner>(Form)->GetMethodName(Button->OnClick.Method()), "Button1Click");
  // The same selection rules: a component selects, the root is the selection when none is.
  KilnRoot(Form)->SelectComponent(Button);
  EXPECT_EQ(KilnRoot(Form)->GetSelection()->Get(0), Button);
  KilnRoot(Form)->ClearSelection();
  EXPECT_EQ(KilnRoot(Form)->GetSelection()->Get(0), Form->GetRoot());

  // The descendant follows the woken ancestor.
  Button->SetLeft(120);
  KilnRoot(Form)->Modified();
  auto* Inherited = static_cast<TButton*>(Heir->GetRoot()->FindComponent("Button1"));
  ASSERT_NE(Inherited, nullptr);
  EXPECT_EQ(Inherited->Left(), 120);
  EXPECT_TRUE(Inherited->ComponentState().Contains(csAncestor));
}

TEST_F(DormancyTest, AFailedReturnLeavesTheModuleDormantWithItsStream) {
  RegisterClass(TRareButton::StaticClass());
  auto Unregister = Finally([]() noexcept { UnRegisterClass(TRareButton::StaticClass()); });
  KilnRoot(Form)->CreateComponent(TRareButton::StaticClass(), Form->GetRoot(), 100, 8, 75, 25);
  std::vector<std::uint8_t> Stream = BytesOf(Form->FormFileOpen());
  Form->GoDormant();
  UnRegisterClass(TRareButton::StaticClass());
  auto Internal = QueryAs<IInternalRoot>(Form);
  EXPECT_THROW(Internal->Resurrect(), EReadError); // unanswered: the read error cancels
  EXPECT_TRUE(Internal->IsDormant());
  EXPECT_EQ(BytesOf(Form->FormFileOpen()), Stream);
  RegisterClass(TRareButton::StaticClass());
  Internal->Resurrect();
  ASSERT_NE(Form->GetRoot(), nullptr);
  EXPECT_NE(Form->GetRoot()->FindComponent("RareButton1"), nullptr);
}

} // namespace
