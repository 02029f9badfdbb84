//===- tests/frameworks/kiln/design/KilnCategoriesTest.cpp - Categories of Kiln's properties ===//
#include "editors/PropertyCategories.h"
#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/KilnListCtrls.h"
#include "frameworks/kiln/KilnMemo.h"
#include "frameworks/kiln/KilnPictures.h"
#include "frameworks/kiln/KilnSplitters.h"
#include "frameworks/kiln/KilnToolBars.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

namespace formkit::fakes {
namespace {

/// The categories other than the miscellaneous one that take `Name` of `Class`.
std::vector<String> CategoriesOf(TClass Class, const String& Name) {
  TPropertyCategoryList* List = PropertyCategoryList();
  std::vector<String> Found;
  for (int I = 0; I < List->Count(); ++I) {
    TPropertyCategory* Category = List->Categories(I);
    if (Category != List->MiscCategory() && Category->Match(Name, Class, nullptr)) Found.push_back(Category->Name());
  }
  return Found;
}

TEST_F(KilnDesignFixture, EveryKilnPropertyButTheNameStandsInACategory) {
  for (TClass Class : {TForm::StaticClass(), TFrame::StaticClass(), TDataModule::StaticClass(),
                       TButton::StaticClass(), TLabel::StaticClass(), TEdit::StaticClass(), TCheckBox::StaticClass(),
                       TPanel::StaticClass(), TTimer::StaticClass(), TStatusBar::StaticClass(),
                       TToolBar::StaticClass(), TSplitter::StaticClass(), TScrollBox::StaticClass(),
                       TShape::StaticClass(), TMemo::StaticClass(), TImage::StaticClass(), TPaintBox::StaticClass(),
                       TAction::StaticClass(), TRadioButton::StaticClass(), TComboBox::StaticClass(),
                       TListBox::StaticClass(), TBevel::StaticClass()}) {
    for (PPropInfo Prop : Class->Properties()) {
      if (Prop->Name == "Name" || Prop->Name == "Tag") continue;
      EXPECT_FALSE(CategoriesOf(Class, Prop->Name).empty()) << Class->ClassName << "." << Prop->Name;
    }
  }
  EXPECT_EQ(CategoriesOf(TButton::StaticClass(), "Caption"), (std::vector<String>{"Localizable", "Visual"}));
  EXPECT_EQ(CategoriesOf(TButton::StaticClass(), "OnClick"), (std::vector<String>{"Mouse"}));
  EXPECT_TRUE(CategoriesOf(TButton::StaticClass(), "Name").empty());
  // A category the inspector hides takes its properties along; the others stay.
  TPropertyCategoryList* List = PropertyCategoryList();
  List->ClearMatches();
  for (const char* Name : {"Left", "Color", "Name"}) (void)List->Match(Name, TButton::StaticClass(), nullptr);
  List->ChangeVisibility(pcvNotListed, {"Layout"});
  EXPECT_FALSE(List->Match("Left", TButton::StaticClass(), nullptr));
  EXPECT_TRUE(List->Match("Color", TButton::StaticClass(), nullptr));
  EXPECT_TRUE(List->Match("Name", TButton::StaticClass(), nullptr));
}

} // namespace
} // namespace formkit::fakes
