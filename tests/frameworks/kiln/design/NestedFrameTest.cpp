//===- tests/frameworks/kiln/design/NestedFrameTest.cpp - A frame module nested in a form ===//
#include "platform/Filer.h"
#include "tests/fakes/Messages.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

struct NestedFrameTest : KilnDesignFixture {
  IPtr<IRoot> FrameModule;
  IPtr<IRoot> FormModule;
  TGeneratedClass ProxyRecord;
  TClass Proxy = nullptr;
  std::vector<String> Calls;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    IPtr<TRecordingModule> Module = New<TRecordingModule>("Frame1.kfm", &Log);
    FrameModule = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Frame1.kfm", false, "Frame1",
                                       "Frame", "", nullptr, "");
    Open.push_back(FrameModule);
    KilnRoot(FrameModule)->CreateComponent(TButton::StaticClass(), FrameModule->GetRoot(), 8, 8, 75, 25);
    FormModule = NewForm("Form1");
    // The class a module stands for when it is nested: what the inheritance support makes.
    ProxyRecord = TClassRec::NewGeneratedClass(TFrame::StaticClass(), "TFrame1", "Frame1");
    Proxy = ProxyRecord.get();
    TRootHooks::IsProxyClass = [this](TClass C) { return C == Proxy; };
    TRootHooks::ChangeToProxyClass = [this](TComponent* Instance, TClass Class) {
      Calls.push_back("ChangeToProxyClass(" + Class->ClassName + ")");
      Instance->SetClassType(Class);
    };
  }
  void TearDown() override {
    TRootHooks::IsProxyClass = nullptr;
    TRootHooks::ChangeToProxyClass = nullptr;
    FrameModule = FormModule = nullptr;
    KilnDesignFixture::TearDown();
    ProxyRecord.reset();
  }

};

TEST_F(NestedFrameTest, AProxyClassBecomesANestedInstanceOfItsModule) {
  TKilnRoot* Form = KilnRoot(FormModule);
  TComponent* Frame = Form->FrameCreateComponent(Proxy, FormModule->GetRoot());
  ASSERT_NE(Frame, nullptr);
  EXPECT_EQ(Frame->Owner(), FormModule->GetRoot());
  EXPECT_EQ(Frame->ClassName(), "TFrame1");
  TComponentState State = Frame->ComponentState();
  EXPECT_TRUE(State.Contains(csInline) && State.Contains(csDesigning) && State.Contains(csDesignInstance));
  EXPECT_TRUE(Form->ModifiableFrame(Frame));
  EXPECT_EQ(Form->GetInliningComponent(Frame), FrameModule->GetRoot());
  // The module's content came along, marked as the ancestor's.
  ASSERT_EQ(Frame->ComponentCount(), 1);
  EXPECT_EQ(Frame->Components(0)->Name(), "Button1");
  EXPECT_TRUE(Frame->Components(0)->ComponentState().Contains(csAncestor));
  EXPECT_EQ(Calls, (std::vector<String>{"ChangeToProxyClass(TFrame1)"}));
  // Its components can be selected on the form, since the form may change the frame.
  EXPECT_TRUE(Form->Surface()->ItemFromComponent(Frame->Components(0))->Selectable());
  // The host's flat list reaches into the frame: the frame, then what it holds.
  EXPECT_EQ(Form->GetCompCount(), 2);
  EXPECT_EQ(Form->GetCompName(0), "Frame1");
  EXPECT_EQ(Form->GetCompName(1), "Frame1.Button1");
  EXPECT_EQ(Form->CompIndexToComponent(1), Frame->Components(0));
  // A component of a nested frame that the ancestor introduced keeps its name.
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Frame->Components(0)->SetName("Other"); }),
            "Cannot rename component Button1, component was introduced in an ancestor form");

  // Gone from the form, it leaves the frame lists.
  Frame->Destroy();
  EXPECT_FALSE(Form->ModifiableFrame(Frame));
  EXPECT_EQ(Form->GetInliningComponent(Frame), nullptr);
}

TEST_F(NestedFrameTest, WhatCannotBeNestedIsRefusedAndLeavesNothing) {
  TKilnRoot* Form = KilnRoot(FormModule);
  TComponent* Root = FormModule->GetRoot();
  EXPECT_EQ(Form->FrameCreateComponent(TFrame::StaticClass(), Root), nullptr); // no proxy class

  // A frame cannot hold itself.
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->FrameCreateComponent(Proxy, FrameModule->GetRoot()); }),
            "A nested component cannot be inserted into itself");
  // A form module does not nest.
  TGeneratedClass FormProxyRecord = TClassRec::NewGeneratedClass(TForm::StaticClass(), "TForm1", "Form1");
  TClass FormProxy = FormProxyRecord.get();
  TRootHooks::IsProxyClass = [&](TClass C) { return C == Proxy || C == FormProxy; };
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->FrameCreateComponent(FormProxy, Root); }),
            "Cannot paste a form or datamodule into another form or datamodule");
  FormProxyRecord.reset();
  // An instance that cannot take its class goes again.
  TRootHooks::ChangeToProxyClass = [](TComponent*, TClass) { throw EComponentDesignerException("no class"); };
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->FrameCreateComponent(Proxy, Root); }), "no class");
  EXPECT_EQ(Root->ComponentCount(), 0);
}
