//===- tests/frameworks/kiln/design/RootSelectionAndNamesTest.cpp - Selection and names of a module ===//
#include "tests/fakes/Messages.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;


struct ModuleTest : KilnDesignFixture {
  IPtr<IRoot> Root;
  TKilnRoot* Kiln = nullptr;
  TComponent* Form = nullptr;
  TComponent* A = nullptr;
  TComponent* B = nullptr;
  void SetUp() override {
    KilnDesignFixture::SetUp();
    Root = NewForm("Form1");
    Kiln = KilnRoot(Root);
    Form = Root->GetRoot();
    A = Kiln->CreateComponent(TButton::StaticClass(), Form, 8, 8, 75, 25);
    B = Kiln->CreateComponent(TButton::StaticClass(), Form, 8, 48, 75, 25);
  }
  void TearDown() override {
    Root = nullptr;
    KilnDesignFixture::TearDown();
  }
  IPtr<IGrabHandles> Handles() { return Kiln->Surface()->GetGrabHandles(); }
};

TEST_F(ModuleTest, AnEmptySelectionReadsAsTheRootUnlessNoSelectionWasAsked) {
  Kiln->ClearSelection();
  EXPECT_EQ(Kiln->GetSelection()->Get(0), Form);
  Kiln->NoSelection();
  EXPECT_EQ(Kiln->GetSelection()->GetCount(), 0);
  Kiln->ClearSelection();
  EXPECT_EQ(Kiln->GetSelection()->GetCount(), 1);
  Kiln->SetSelection("Form1");
  EXPECT_TRUE(Kiln->IsRootSelected());
  Kiln->SetSelection("Button2");
  EXPECT_EQ(Kiln->SelectedComponent(), B);
  EXPECT_FALSE(Kiln->IsAnchorSelection(B)); // a single selection has no anchor
}

TEST_F(ModuleTest, HandlesStandOnASingleSelectionAndMarksOnSeveral) {
  Kiln->Select(A, false);
  Kiln->Select(B, true);
  EXPECT_TRUE(Kiln->IsAnchorSelection(A));
  EXPECT_EQ(Handles()->GetAttachedItem(), nullptr);
  auto MarkedOf = [&](TComponent* C) { return QueryAs<IInternalItem>(Kiln->FindSelection(C)); };
  ASSERT_TRUE(MarkedOf(A));
  // From two to one: the one left carries the handles again.
  Kiln->SelectionItems()->Remove(Kiln->FindSelection(A));
  EXPECT_TRUE(SameItem(Handles()->GetAttachedItem(), Kiln->Surface()->ItemFromComponent(B)));
  // Removing the one selected object takes the handles off it.
  B->Destroy();
  EXPECT_EQ(Handles()->GetAttachedItem(), nullptr);
  EXPECT_EQ(Kiln->SelectedComponent(), nullptr);
  EXPECT_EQ(Log.Count("ItemDeleted(Button2)"), 1); // the host was told
}

TEST_F(ModuleTest, HandlesAreActiveOnlyOnTheActiveUnlockedModule) {
  Kiln->Select(B, false);
  auto* Handles = static_cast<TKilnGrabHandles*>(Kiln->Surface()->GetGrabHandles().Get());
  TRect Bounds = static_cast<TControl*>(B)->BoundsRect();
  TMoveAffects Corner{gaRight, gaBottom};
  EXPECT_EQ(Handles->HandleAtPoint(Bounds.Right, Bounds.Bottom), Corner);
  Kiln->SetActive(false);
  EXPECT_FALSE(Handles->Active());
  EXPECT_TRUE(Handles->HandleAtPoint(Bounds.Right, Bounds.Bottom).Empty());
  Kiln->SetControlsLocked(true);
  Kiln->SetActive(true);
  EXPECT_FALSE(Handles->Active()); // locked controls show their handles, inactive
  Kiln->SetControlsLocked(false);
  Kiln->SetActive(true);
  EXPECT_TRUE(Handles->Active());
}

TEST_F(ModuleTest, ListsComingBackDuringABatchAreIgnored) {
  IPtr<IDesignerSelections> List = CreateSelectionList();
  List->Add(B);
  Kiln->Select(A, false);
  Kiln->SelectionItems()->BeginSelections();
  Kiln->SetSelections(List);
  Kiln->SelectionItems()->EndSelections();
  EXPECT_EQ(Kiln->SelectedComponent(), A);
  Kiln->SetSelections(List);
  EXPECT_EQ(Kiln->SelectedComponent(), B);
}

TEST_F(ModuleTest, SelectingAComponentOfAnotherModuleBringsThatModuleForward) {
  IPtr<IRoot> Other = NewForm("Form2");
  TKilnRoot* OtherKiln = KilnRoot(Other);
  TComponent* C = OtherKiln->CreateComponent(TButton::StaticClass(), Other->GetRoot(), 8, 8, 75, 25);
  Kiln->Select(A, false);
  Kiln->SelectComponent(static_cast<TPersistent*>(C));
  EXPECT_EQ(OtherKiln->SelectedComponent(), C);
  EXPECT_EQ(Kiln->SelectedComponent(), A); // this module's selection stays
  EXPECT_TRUE(OtherKiln->DesignWindow()->Visible());
  EXPECT_EQ(Designer->GetRoots(0).Get(), Other.Get()); // activated: first in the list
}

TEST_F(ModuleTest, NamesAreGivenInOrderAndRenamesFollowTheRules) {
  EXPECT_EQ(A->Name(), "Button1");
  EXPECT_EQ(B->Name(), "Button2");
  EXPECT_EQ(Kiln->UniqueName("TButton"), "Button3");
  EXPECT_EQ(Kiln->UniqueName("T"), "T1");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { A->SetName("Owner"); }),
            "A component named Owner already exists in a descendant module");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->SetName(""); }), "Root component must have a name");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->SetName("CustomForm"); }),
            "Cannot rename a module to the same name as one of its ancestors (TCustomForm)");
  EXPECT_EQ(Form->Name(), "Form1");
  // An allowed rename reaches the host's source and the environment.
  Log.Clear();
  EXPECT_TRUE(Kiln->RenameComponent("Button1", "OkButton"));
  EXPECT_FALSE(Kiln->RenameComponent("Nothing", "X"));
  EXPECT_EQ(Log.Calls, (std::vector<String>{"RenameComponent(Button1,OkButton)", "ComponentRenamed(Button1,OkButton)"}));
  Kiln->SetRootName("MainForm");
  EXPECT_EQ(Root->GetRootName(), "MainForm");
  EXPECT_EQ(Log.Count("ValidateComponentName(MainForm)"), 1);
}

TEST_F(ModuleTest, WhatMayNotBeDeletedSaysWhy) {
  A->SetAncestor(true);
  IPtr<IItem> Item = Kiln->Surface()->ItemFromComponent(A);
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Item->ValidateDeletable(); }),
            "Selection contains a component, Button1, introduced in an ancestor and cannot be deleted");
  IPtr<IItem> Loose = NewAs<IItem, TNonControlItem>(static_cast<TControl*>(B)->Font(), Kiln->AsDesigner());
  EXPECT_EQ(MessageOf<ECannotDeleteNonComponentException>([&] { Loose->ValidateDeletable(); }),
            "Cannot delete a TPersistent from the designer");
  EXPECT_EQ(Loose->GetBoundsRect(), Rect(-100, -100, -100, -100));
  EXPECT_FALSE(Loose->Selectable());
  A->SetAncestor(false);
}

TEST_F(ModuleTest, TheFlatListOfComponentsAndTheirClasses) {
  EXPECT_EQ(Kiln->GetCompCount(), 2);
  EXPECT_EQ(Kiln->GetCompName(-1), "Form1");
  EXPECT_EQ(Kiln->GetCompName(1), "Button2");
  EXPECT_EQ(Kiln->GetCompType(0), "TButton");
  EXPECT_EQ(Kiln->GetCompName(2), "");
  EXPECT_EQ(Kiln->CompIndexToComponent(5), nullptr);
  EXPECT_EQ(Kiln->FindCompClass("button1"), "KilnStdCtrls.TButton");
  EXPECT_EQ(Kiln->FindCompClass("Nothing"), "");
}
