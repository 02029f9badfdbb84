//===- tests/frameworks/kiln/design/DesignedFormStreamingTest.cpp - A designed form as a file ===//
#include "platform/Filer.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

TEST_F(KilnDesignFixture, AFormBuiltOnTheSurfaceRoundTripsAndWritesOnlyItsEdits) {
  Env->Options.UseDesignerGuidelines = false;
  IPtr<IRoot> Root = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Root);
  TKilnSurface* S = KilnSurfaceOf(Root);
  Arm(TPanel::StaticClass());
  Drag(S, {16, 16}, {216, 112});
  Arm(TButton::StaticClass());
  Drag(S, {40, 40}, {120, 64});
  Arm(nullptr);
  Kiln->CreateComponentPos(NewAs<IInternalPaletteItem, TToolItem>(TTimer::StaticClass()), 300, 300);
  TComponent* Form = Root->GetRoot();
  String Original = FormImage(Form);
  EXPECT_NE(Original.find("object Form1: TForm1\n"), String::npos); // the module's own class
  EXPECT_NE(Original.find("object Panel1: TPanel"), String::npos);
  EXPECT_NE(Original.find("object Button1: TButton"), String::npos);
  EXPECT_NE(Original.find("object Timer1: TTimer"), String::npos);

  // Read back into a fresh form: the same tree, the same file.
  TObjectGuard<TMemoryStream> Data(new TMemoryStream);
  {
    TObjectGuard<TWriter> Writer(new TWriter(Data.Get(), 4096));
    Writer->WriteDescendent(Form, nullptr);
  }
  Data->SetPosition(0);
  TObjectGuard<TForm> Copy(CreateComponentOf<TForm>(nullptr));
  {
    TObjectGuard<TReader> Reader(new TReader(Data.Get(), 4096));
    Reader->ReadRootComponent(Copy.Get());
  }
  ASSERT_EQ(Copy->ComponentCount(), 3);
  auto* Button = static_cast<TControl*>(Copy->FindComponent("Button1"));
  ASSERT_NE(Button, nullptr);
  EXPECT_EQ(Button->Parent(), Copy->FindComponent("Panel1"));
  EXPECT_EQ(Button->BoundsRect(), static_cast<TControl*>(Form->FindComponent("Button1"))->BoundsRect());
  EXPECT_EQ(Copy->FindComponent("Timer1")->DesignInfo(), Form->FindComponent("Timer1")->DesignInfo());
  // The copy is a plain form: the same file but for the class of the module's root.
  String Plain = Original;
  Plain.replace(Plain.find("TForm1"), 6, "TForm");
  EXPECT_EQ(FormImage(Copy.Get()), Plain);

  // Nudged on the surface, the module differs from the copy in the button's left only.
  Kiln->Select(Form->FindComponent("Button1"), false);
  S->KeyDown(dkRight, {ssCtrl});
  String Difference = FormImage(Form, Copy.Get());
  EXPECT_NE(Difference.find("inherited Button1: TButton"), String::npos);
  EXPECT_NE(Difference.find("Left = "), String::npos);
  EXPECT_EQ(Difference.find("Top = "), String::npos);
  EXPECT_EQ(Difference.find("object "), String::npos); // nothing new
}
