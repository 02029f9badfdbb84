//===- tests/editors/CustomModuleTest.cpp - Which classes a module takes ----===//
#include "editors/CustomModule.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnStdCtrls.h"

#include <gtest/gtest.h>

using namespace formkit;

/// Another framework whose button has the Kiln button's name.
namespace elsewhere {
class TButton : public TComponent {
  FK_CLASS(TButton, TComponent)
};
class TRoundButton : public TButton {
  FK_CLASS(TRoundButton, TButton)
};
FK_IMPLEMENT(TButton, "Elsewhere") {}
FK_IMPLEMENT(TRoundButton, "Elsewhere") {}
} // namespace elsewhere

namespace {

struct CustomModuleTest : ::testing::Test {
  void SetUp() override { InitializeKiln(); }
  void TearDown() override { FinalizeKiln(); }
};

String Message(const std::function<void()>& Action) {
  try {
    Action();
  } catch (const Exception& E) {
    return String(E.ClassName()) + ": " + E.Message();
  }
  return "no exception";
}

} // namespace

TEST_F(CustomModuleTest, AModuleTakesTheClassesItsRootsGroupKnowsByName) {
  TObjectGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  IPtr<TBaseCustomModule> Made =
      NewFromClass<TBaseCustomModule>(TCustomModule::StaticClass(), Form.Get(), IPtr<IDesigner>());
  auto* Module = dynamic_cast<TCustomModule*>(Made.Get());
  ASSERT_NE(Module, nullptr);
  EXPECT_EQ(Module->GetFinderClass(), TForm::StaticClass());
  EXPECT_TRUE(Module->ValidateComponentClass(TButton::StaticClass()));
  EXPECT_FALSE(Module->ValidateComponentClass(elsewhere::TButton::StaticClass())) << "a namesake from elsewhere";
  auto* Button = CreateComponentOf<TButton>(Form.Get());
  EXPECT_NO_THROW(Module->ValidateComponent(Button));
  TObjectGuard<elsewhere::TButton> Foreign(CreateComponentOf<elsewhere::TButton>(nullptr));
  EXPECT_EQ(Message([&] { Module->ValidateComponent(Foreign.Get()); }),
            "ENonAIRException: Class TButton is not applicable to this module");
  // The base module offers nothing of its own.
  EXPECT_EQ(Module->GetVerbCount(), 0);
  EXPECT_FALSE(Module->Nestable());
  EXPECT_TRUE(Module->GetAttributes().Empty());
}

TEST_F(CustomModuleTest, ClassNamesAreMatchedUpTheLineWithoutRegardToCase) {
  EXPECT_TRUE(ClassInheritsFrom(TButton::StaticClass(), "twincontrol"));
  EXPECT_TRUE(ClassInheritsFrom(TButton::StaticClass(), "TButton"));
  EXPECT_FALSE(ClassInheritsFrom(TButton::StaticClass(), "TForm"));
  EXPECT_FALSE(ClassInheritsFrom(nullptr, "TObject"));
  EXPECT_TRUE(AncestorNameMatches(TButton::StaticClass(), TWinControl::StaticClass()));
  EXPECT_TRUE(AncestorNameMatches(TButton::StaticClass(), TForm::StaticClass())) << "no ancestor of that name";
  EXPECT_FALSE(AncestorNameMatches(elsewhere::TRoundButton::StaticClass(), TButton::StaticClass()))
      << "its ancestor of that name is another class";
}

TEST_F(CustomModuleTest, AFinderLooksInItsClassGroupWhateverGroupIsCurrent) {
  TClassFinder Kiln(TForm::StaticClass());
  EXPECT_EQ(Kiln.GetClass("tbutton"), TButton::StaticClass());
  TClassFinder Base(TComponent::StaticClass());
  EXPECT_EQ(Base.GetClass("TButton"), nullptr) << "the Kiln group is not the base group";
  TClass Before = ActivateClassGroup(TForm::StaticClass());
  TClassFinder Active(TComponent::StaticClass(), true);
  EXPECT_EQ(Active.GetClass("TButton"), TButton::StaticClass());
  ActivateClassGroup(Before);
}
