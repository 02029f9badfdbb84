//===- tests/frameworks/kiln/design/RootStateTest.cpp - Options, locks and services of a module ===//
#include "platform/ScopeGuard.h"
#include "tests/fakes/Messages.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

TEST_F(KilnDesignFixture, OptionsReachTheEngineAndTheSurface) {
  IPtr<IRoot> Root = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Root);
  EXPECT_EQ(Kiln->SurfaceDesigner()->GetGridSize(), Point(8, 8));
  EXPECT_TRUE(Kiln->SurfaceDesigner()->GetGridAligned());

  // A scaled grid follows the pixels per inch of the current parent; the surface keeps
  // the unscaled size to draw.
  ControlPPIHook = [](const TControl*) { return 144; };
  Env->Options.ScaleGridSize = true;
  Env->Options.GridSizeX = 8;
  Env->Options.GridSizeY = 4;
  Env->Options.SnapToGrid = false;
  Env->Options.UseDesignerGuidelines = false;
  Env->Options.ShowComponentCaptions = true;
  Designers()->DesignerOptionsChanged();
  EXPECT_EQ(Kiln->SurfaceDesigner()->GetGridSize(), Point(12, 6));
  EXPECT_FALSE(Kiln->SurfaceDesigner()->GetGridAligned());
  EXPECT_FALSE(Kiln->SurfaceDesigner()->GetGuidelines());
  EXPECT_EQ(Kiln->KilnSurface()->Options().GridSize, Point(8, 4));
  EXPECT_TRUE(Kiln->KilnSurface()->Options().ShowComponentCaptions);
  ControlPPIHook = nullptr;
}

TEST_F(KilnDesignFixture, LockedControlsDoNotMoveButCanBeSelected) {
  Env->Options.UseDesignerGuidelines = false;
  IPtr<IRoot> Root = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Root);
  auto* Button = static_cast<TControl*>(Kiln->CreateComponent(TButton::StaticClass(), Root->GetRoot(), 8, 8, 75, 25));
  Designers()->SetControlsLocked(true);
  EXPECT_TRUE(Kiln->SurfaceDesigner()->GetLocked());
  Kiln->ClearSelection();
  Drag(KilnSurfaceOf(Root), {20, 20}, {60, 60});
  EXPECT_EQ(Button->BoundsRect(), Rect(8, 8, 83, 33));
  EXPECT_EQ(Kiln->SelectedComponent(), Button);
  Designers()->SetControlsLocked(false);
  EXPECT_FALSE(Kiln->SurfaceDesigner()->GetLocked());
}

TEST_F(KilnDesignFixture, ServicesThatJoinLaterAreNamedWhenMissing) {
  // An existing module whose file is not there; the designer's list stays as it was.
  IPtr<TRecordingModule> Module = New<TRecordingModule>("Old.kfm", &Log);
  EXPECT_EQ(MessageOf<EFOpenError>([&] {
              Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Old.kfm", true, "", "", "", nullptr, "");
            }),
            "Cannot open file \"Old.kfm\". No such file or directory");
  EXPECT_EQ(Designer->GetRootsCount(), 0);

  IPtr<IRoot> Root = NewForm("Form1", &Module);
  auto Designer1 = QueryAs<IDesigner>(Root);
  // A method in the source reaches the host and is a method of the designed class.
  EXPECT_EQ(Designer1->GetMethodName(Designer1->CreateMethod("Button1Click", IPtr<IEventInfo>())), "Button1Click");
  EXPECT_EQ(Module->SourceMethods, std::vector<String>{"Button1Click"});
  // Without the generated classes the designed class cannot take it.
  auto Hook = std::exchange(TRootHooks::CreateSubClassMethod, nullptr);
  auto Restore = Finally([&]() noexcept { TRootHooks::CreateSubClassMethod = std::move(Hook); });
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Designer1->CreateMethod("Button2Click", IPtr<IEventInfo>()); }),
            "Adding a method to the designed class is not available");
  EXPECT_TRUE(Designer1->MethodExists("button1click"));
  EXPECT_FALSE(Designer1->CreateMethod("", IPtr<IEventInfo>()).IsAssigned());
  EXPECT_THROW(Designer1->CreateMethod("Other", static_cast<const TTypeData*>(nullptr)), EArgumentException);

  // Lookups by name, the root itself included.
  TComponent* Button = KilnRoot(Root)->CreateComponent(TButton::StaticClass(), Root->GetRoot(), 8, 8, 75, 25);
  EXPECT_EQ(Designer1->GetComponent("FORM1"), Root->GetRoot());
  EXPECT_EQ(Designer1->GetComponent("Button1"), Button);
  EXPECT_EQ(Designer1->GetComponentName(Button), "Button1");
  std::vector<String> Names;
  TTypeData Buttons;
  Buttons.ClassRef = TButton::StaticClass();
  Designer1->GetComponentNames(&Buttons, [&](const String& N) { Names.push_back(N); });
  EXPECT_EQ(Names, std::vector<String>{"Button1"});
  EXPECT_EQ(Designer1->GetDesignerExtension(), ".kfm");
  EXPECT_EQ(Designer1->GetPathAndBaseExeName(), "/opt/host/bin/host");
}
