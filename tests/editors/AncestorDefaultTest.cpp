//===- tests/editors/AncestorDefaultTest.cpp - Defaults against an ancestor module ===//
#include "tests/editors/EditorSamples.h"

#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit::samples {
namespace {

/// A module whose root is a given form, optionally inheriting from another module.
class TFormModule : public fakes::TFakeRoot {
  FK_CLASS(TFormModule, fakes::TFakeRoot)
  TFormModule(TForm* Form, IPtr<IDesigner> Ancestor, fakes::TCallLog* Log)
      : TFakeRoot(Form->Name(), Log), FForm(Form), FAncestor(std::move(Ancestor)) {}
  TComponent* GetRoot() override { return FForm; }
  IPtr<IDesigner> GetAncestorDesigner() override { return FAncestor; }

private:
  TForm* FForm;
  IPtr<IDesigner> FAncestor;
};
FK_IMPLEMENT(TFormModule, "GadgetUnit") {}

struct AncestorDefaultTest : EditorFixture {
  TForm* Ancestor = nullptr;
  TForm* Descendant = nullptr;
  IPtr<IDesigner> DescendantDesigner;

  void SetUp() override {
    InitializeKiln();
    EditorFixture::SetUp();
    Ancestor = BuildForm("Form1", false);
    Descendant = BuildForm("Form2", true);
    IPtr<IDesigner> AncestorDesigner = InterfaceOf<IDesigner>(New<TFormModule>(Ancestor, nullptr, &Log).Get());
    DescendantDesigner = InterfaceOf<IDesigner>(New<TFormModule>(Descendant, AncestorDesigner, &Log).Get());
  }
  void TearDown() override {
    DescendantDesigner = nullptr;
    Descendant->Destroy();
    Ancestor->Destroy();
    EditorFixture::TearDown();
    FinalizeKiln();
  }

  /// A form with a button at (8, 8) and a panel holding a button at (16, 16); in the
  /// descendant every one of them comes from the ancestor.
  static TForm* BuildForm(const String& Name, bool Inherited) {
    TForm* Form = CreateComponentOf<TForm>(nullptr);
    Form->SetName(Name);
    auto* Button1 = CreateComponentOf<TButton>(Form);
    Button1->SetName("Button1");
    Button1->SetParent(Form);
    Button1->SetBounds(8, 8, 75, 25);
    auto* Panel1 = CreateComponentOf<TPanel>(Form);
    Panel1->SetName("Panel1");
    Panel1->SetParent(Form);
    auto* Button2 = CreateComponentOf<TButton>(Form);
    Button2->SetName("Button2");
    Button2->SetParent(Panel1);
    Button2->SetBounds(16, 16, 75, 25);
    for (TComponent* C : {static_cast<TComponent*>(Button1), static_cast<TComponent*>(Panel1),
                          static_cast<TComponent*>(Button2)})
      C->SetAncestor(Inherited);
    return Form;
  }

  bool IsDefault(TComponent* C, std::string_view Prop) {
    return QueryAs<IProperty70>(EditorOf({C}, Prop, DescendantDesigner))->GetIsDefault();
  }
};

TEST_F(AncestorDefaultTest, AnInheritedComponentComparesWithItsCounterpartInTheAncestor) {
  auto* Button1 = static_cast<TButton*>(Descendant->FindComponent("Button1"));
  auto* Button2 = static_cast<TButton*>(Descendant->FindComponent("Button2"));
  // Left 8 differs from the class's default, but not from the ancestor's button.
  EXPECT_TRUE(IsDefault(Button1, "Left"));
  EXPECT_TRUE(IsDefault(Button1, "Caption"));
  EXPECT_TRUE(IsDefault(Button2, "Left")); // found beneath the ancestor's panel
  Button1->SetLeft(9);
  EXPECT_FALSE(IsDefault(Button1, "Left"));
  static_cast<TButton*>(Ancestor->FindComponent("Button2"))->SetLeft(17);
  EXPECT_FALSE(IsDefault(Button2, "Left"));
}

TEST_F(AncestorDefaultTest, AComponentTheAncestorLacksComparesWithTheClassDefault) {
  auto* Button3 = CreateComponentOf<TButton>(Descendant);
  Button3->SetName("Button3");
  Button3->SetParent(Descendant);
  EXPECT_TRUE(IsDefault(Button3, "Tag"));
  EXPECT_FALSE(IsDefault(Button3, "Left")); // a position has no default: always written
  Button3->SetTag(5);
  EXPECT_FALSE(IsDefault(Button3, "Tag"));
  // Not marked as inherited: the class's default, whatever the ancestor holds.
  auto* Button1 = static_cast<TButton*>(Descendant->FindComponent("Button1"));
  Button1->SetAncestor(false);
  EXPECT_FALSE(IsDefault(Button1, "Left"));
}

} // namespace
} // namespace formkit::samples
