//===- tests/editors/PropertyCategoriesTest.cpp - Properties grouped by category ===//
#include "editors/EditorRegistry.h"
#include "editors/PropertyCategories.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "tests/editors/EditorSamples.h"

namespace formkit {
namespace {

using samples::EditorFixture;

struct PropertyCategoriesTest : EditorFixture {
  TPropertyCategoryList* List = nullptr;
  void SetUp() override {
    EditorFixture::SetUp();
    InitializeKiln();
    List = PropertyCategoryList();
  }
  void TearDown() override {
    GetHiddenCategoriesProc = nullptr;
    SetHiddenCategoriesProc = nullptr;
    FinalizeKiln();
    EditorFixture::TearDown();
  }
  /// One pass over `Names` of `Class`, as the inspector makes it: what is shown.
  std::vector<String> Shown(TClass Class, const std::vector<String>& Names) {
    List->ClearMatches();
    std::vector<String> Result;
    for (const String& Name : Names)
      if (List->Match(Name, Class, nullptr)) Result.push_back(Name);
    return Result;
  }
};

TEST_F(PropertyCategoriesTest, FiltersTakePropertiesByMaskClassAndType) {
  RegisterPropertyInCategory(LoadResString(sLayoutCategoryName), TControl::StaticClass(), "");
  RegisterPropertyInCategory(LoadResString(sHelpCategoryName), "*Hint*");
  RegisterPropertyInCategory(LoadResString(sVisualCategoryName), TGraphicsObject::StaticClass()->TypeInfo());
  RegisterPropertyInCategory(LoadResString(sLocaleCategoryName), TypeInfo<TAlign>(), "");
  // An empty mask with a class takes every property of the class and its descendants.
  EXPECT_TRUE(IsPropertyInCategory("Layout", TButton::StaticClass(), "Caption"));
  EXPECT_FALSE(IsPropertyInCategory("Layout", TTimer::StaticClass(), "Interval"));
  // Masks match by wildcard, without regard to case.
  EXPECT_TRUE(IsPropertyInCategory("Help and Hints", TButton::StaticClass(), "hint"));
  EXPECT_TRUE(IsPropertyInCategory("Help and Hints", TTimer::StaticClass(), "ShowHints"));
  EXPECT_FALSE(IsPropertyInCategory("Help and Hints", TButton::StaticClass(), "Caption"));
  // A base class type takes a property of a descendant class type; an ordinal type only
  // its own record.
  EXPECT_TRUE(IsPropertyInCategory("Visual", TButton::StaticClass(), "Font"));
  EXPECT_FALSE(IsPropertyInCategory("Visual", TButton::StaticClass(), "Caption"));
  EXPECT_TRUE(IsPropertyInCategory("Locale", TPanel::StaticClass(), "Align"));
  EXPECT_FALSE(IsPropertyInCategory("Locale", TPanel::StaticClass(), "TabOrder"));
  EXPECT_TRUE(IsPropertyInCategory("Locale", "TPanel", "Align"));
  EXPECT_THROW(IsPropertyInCategory("Locale", "TNoSuchClass", "Align"), EClassNotFound);
  // An unknown category is made, and takes nothing.
  int Before = List->Count();
  EXPECT_FALSE(IsPropertyInCategory("Nowhere", TButton::StaticClass(), "Caption"));
  EXPECT_EQ(List->Count(), Before + 1);
  EXPECT_EQ(List->Categories(0)->Name(), "Nowhere");

  // The mixed form registers each element; another kind stops it, with what came before.
  RegisterPropertiesInCategory(LoadResString(sInputCategoryName), {TCategoryFilter("Enabled"), TCategoryFilter(TTimer::StaticClass())});
  EXPECT_TRUE(IsPropertyInCategory("Input", TButton::StaticClass(), "Enabled"));
  EXPECT_TRUE(IsPropertyInCategory("Input", TTimer::StaticClass(), "Interval"));
  try {
    RegisterPropertiesInCategory(LoadResString(sKeyCategoryName), {TCategoryFilter("TabStop"), TCategoryFilter(0, nullptr)});
    FAIL();
  } catch (const Exception& E) {
    EXPECT_EQ(E.Message(), "Property filters may only be name, class or type based (1:0)");
  }
  EXPECT_TRUE(IsPropertyInCategory("Key", TButton::StaticClass(), "TabStop"));
}

TEST_F(PropertyCategoriesTest, APropertyIsShownByAVisibleCategoryOrElseByTheMiscellaneousOne) {
  RegisterPropertyInCategory(LoadResString(sVisualCategoryName), TControl::StaticClass(), "Left");
  RegisterPropertyInCategory(LoadResString(sVisualCategoryName), TControl::StaticClass(), "Visible");
  RegisterPropertyInCategory(LoadResString(sLayoutCategoryName), TControl::StaticClass(), "Left"); // walked first: newest
  TClass Button = TButton::StaticClass();
  EXPECT_EQ(Shown(Button, {"Left", "Visible", "Caption"}), (std::vector<String>{"Left", "Visible", "Caption"}));
  // Each category counted what it took, up to the first visible one for each property.
  EXPECT_EQ(List->FindCategory("Layout")->MatchCount(), 1);
  EXPECT_EQ(List->FindCategory("Visual")->MatchCount(), 1); // Left stopped at Layout
  EXPECT_EQ(List->MiscCategory()->MatchCount(), 1);

  // Hidden in one category and visible in the other: still shown. Hidden in all: not.
  EXPECT_TRUE(List->ChangeVisibility(pcvNotListed, {"Layout"}));
  EXPECT_FALSE(List->FindCategory("Layout")->Visible());
  EXPECT_EQ(Shown(Button, {"Left", "Visible", "Caption"}), (std::vector<String>{"Left", "Visible", "Caption"}));
  List->ChangeVisibility(pcvOnlyListed, {"Layout"});
  EXPECT_EQ(Shown(Button, {"Left", "Visible", "Caption"}), (std::vector<String>{"Left"}));
  // The miscellaneous category takes what no other takes; hiding it hides that.
  EXPECT_FALSE(List->MiscCategory()->Visible());

  // Right after clearing, no category matched anything: nothing changes.
  List->ClearMatches();
  EXPECT_FALSE(List->ChangeVisibility(pcvNone));
  EXPECT_FALSE(List->ChangeVisibility(pcvAll));
  Shown(Button, {"Left", "Caption"});
  EXPECT_TRUE(List->ChangeVisibility(pcvToggle));
  EXPECT_FALSE(List->FindCategory("Layout")->Visible());
  EXPECT_TRUE(List->MiscCategory()->Visible());
}

TEST_F(PropertyCategoriesTest, TheDesignObjectFormAndTheMiscellaneousFilters) {
  RegisterPropertyInCategory(LoadResString(sLayoutCategoryName), TControl::StaticClass(), "Left");
  auto* Button = CreateComponentOf<TButton>(Owner);
  IPtr<IDesignObject> Object = NewAs<IDesignObject, TDesignObject>(Button);
  TPropertyCategory* Layout = List->FindCategory("Layout");
  EXPECT_TRUE(Layout->Match("Left", Object, nullptr));
  EXPECT_FALSE(Layout->Match("Top", Object, nullptr));
  EXPECT_FALSE(Layout->Match("Left", nullptr, nullptr)); // no persistent behind it
  // The miscellaneous category takes everything in both forms: its plain filter in the
  // object form, its class-and-type filter in the class form.
  TPropertyCategory* Misc = List->MiscCategory();
  EXPECT_TRUE(Misc->Match("Anything", nullptr, nullptr));
  EXPECT_TRUE(Misc->Match("Anything", TTimer::StaticClass(), nullptr));
  EXPECT_TRUE(List->Match("Top", Object, nullptr));
  EXPECT_EQ(Misc->Count(), 2);
}

TEST_F(PropertyCategoriesTest, HiddenNamesComeFromTheHostAndGoBackToIt) {
  String Stored = "Layout,\"Drag Drop/Docking\"";
  GetHiddenCategoriesProc = [&] { return Stored; };
  SetHiddenCategoriesProc = [&](const String& Text) { Stored = Text; };
  RegisterPropertyInCategory(LoadResString(sLayoutCategoryName), TControl::StaticClass(), "Left");
  List->LoadHiddenCategories();
  EXPECT_FALSE(List->FindCategory("Layout")->Visible());
  EXPECT_FALSE(List->FindCategory("Drag Drop/Docking")->Visible()); // made hidden
  EXPECT_TRUE(List->FindCategory("Visual")->Visible());
  List->FindCategory("Visual")->SetVisible(false);
  List->FindCategory("Layout")->SetVisible(true);
  List->SaveHiddenCategories();
  EXPECT_EQ(Stored, "Visual,\"Drag Drop/Docking\"");
}

TEST_F(PropertyCategoriesTest, APackagesCategoriesAndFiltersGoWithItsGroup) {
  RegisterPropertyInCategory(LoadResString(sLayoutCategoryName), TControl::StaticClass(), "Left");
  int Group = NewEditorGroup();
  RegisterPropertyInCategory(LoadResString(sLayoutCategoryName), TControl::StaticClass(), "Top");
  RegisterPropertyInCategory("Package Only", TControl::StaticClass(), "Width");
  RegisterPropertyInCategory(LoadResString(sMiscellaneousCategoryName), TControl::StaticClass(), "Height");
  int Misc = List->MiscCategory()->Count();
  FreeEditorGroup(Group);
  EXPECT_EQ(List->IndexOf("Package Only"), -1);
  EXPECT_EQ(List->FindCategory("Layout")->Count(), 1);
  EXPECT_TRUE(IsPropertyInCategory("Layout", TButton::StaticClass(), "Left"));
  EXPECT_FALSE(IsPropertyInCategory("Layout", TButton::StaticClass(), "Top"));
  // A package's filter in the miscellaneous category stays.
  EXPECT_EQ(List->MiscCategory()->Count(), Misc);
}

} // namespace
} // namespace formkit
