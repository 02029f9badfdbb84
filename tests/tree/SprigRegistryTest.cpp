//===- tests/tree/SprigRegistryTest.cpp - Choosing the sprig class -------===//
//
// The closest class registration wins at any registration order, the newer on
// a tie; interface registrations win outright; a minimum refuses rather than
// looks further; one answer is remembered, and a package group that goes takes
// its registrations and the memory of them along.
//
//===----------------------------------------------------------------------===//
#include "editors/EditorRegistry.h"
#include "platform/TypInfoBuilder.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

struct IPlugged : IInterface {
  FK_INTERFACE(IPlugged, IInterface, "{4C1D7E20-5B9A-4F63-8E0D-2A6B9C3F7E51}")
};
struct IShown : IInterface {
  FK_INTERFACE(IShown, IInterface, "{9E2F6A41-0C3B-4D85-A7F1-6B8C2D4E0A93}")
};

/// A persistent that answers to both interfaces.
class TPluggedThing : public TPersistent, public IPlugged, public IShown {
  FK_CLASS(TPluggedThing, TPersistent)
  FK_INTERFACES(IPlugged, IShown)
};
FK_IMPLEMENT(TPluggedThing, "SprigRegistryTest") {}

/// A persistent that answers to one.
class THalfPluggedThing : public TPersistent, public IPlugged {
  FK_CLASS(THalfPluggedThing, TPersistent)
  FK_INTERFACES(IPlugged)
};
FK_IMPLEMENT(THalfPluggedThing, "SprigRegistryTest") {}

class TControlSprig : public TComponentSprig {
  FK_CLASS(TControlSprig, TComponentSprig)
};
FK_IMPLEMENT(TControlSprig, "SprigRegistryTest") {}
class TWinControlSprig : public TComponentSprig {
  FK_CLASS(TWinControlSprig, TComponentSprig)
};
FK_IMPLEMENT(TWinControlSprig, "SprigRegistryTest") {}
class TPluggedSprig : public TPersistentSprig {
  FK_CLASS(TPluggedSprig, TPersistentSprig)
};
FK_IMPLEMENT(TPluggedSprig, "SprigRegistryTest") {}
class TFormSprig : public TRootSprig {
  FK_CLASS(TFormSprig, TRootSprig)
};
FK_IMPLEMENT(TFormSprig, "SprigRegistryTest") {}

using SprigRegistryTest = TreeFixture;

TEST_F(SprigRegistryTest, TheClosestRegistrationWinsAndInterfacesWinOutright) {
  // The defaults of the core.
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TComponentSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TStatusPanels::StaticClass()), TCollectionSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TStatusPanel::StaticClass()), TCollectionItemSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TPluggedThing::StaticClass()), TPersistentSprig::StaticClass());
  EXPECT_EQ(FindBestRootSprigClass(TForm::StaticClass()), TRootSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TObject::StaticClass()), nullptr);
  EXPECT_EQ(FindBestSprigClass(nullptr), nullptr);

  // Closer beats newer: a control class and a windowed control class, both orders.
  RegisterSprigType(TWinControl::StaticClass(), TWinControlSprig::StaticClass());
  RegisterSprigType(TControl::StaticClass(), TControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TWinControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TLabel::StaticClass()), TControlSprig::StaticClass());
  RegisterSprigType(TWinControl::StaticClass(), TWinControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TWinControlSprig::StaticClass());
  // The same class twice: the later stands.
  RegisterSprigType(TControl::StaticClass(), TComponentSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TLabel::StaticClass()), TComponentSprig::StaticClass());
  // Generations are counted: exactly the class scores 0.
  TSprigType Entry{0, TControl::StaticClass(), TControlSprig::StaticClass()};
  EXPECT_EQ(Entry.Score(TControl::StaticClass()), 0);
  EXPECT_EQ(Entry.Score(TButton::StaticClass()), 2);
  EXPECT_EQ(Entry.Score(TPanel::StaticClass()), 3);
  EXPECT_EQ(Entry.Score(TTimer::StaticClass()), INT_MAX);

  // A class that descends from no registration gets nothing, and the memory stands.
  TSprigTypeList* Registry = SprigRegistry();
  EXPECT_EQ(FindBestSprigClass(TLabel::StaticClass()), TComponentSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TObject::StaticClass()), nullptr);
  EXPECT_EQ(Registry->MatchCache(TLabel::StaticClass()), TComponentSprig::StaticClass());
  EXPECT_EQ(Registry->MatchCache(TObject::StaticClass()), nullptr);

  // An interface registration beats a class registration of score 0; every interface
  // must be there.
  RegisterSprigType(TPluggedThing::StaticClass(), TPersistentSprig::StaticClass());
  RegisterSprigType(TGUIDArray{IPlugged::IID, IShown::IID}, TPluggedSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TPluggedThing::StaticClass()), TPluggedSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(THalfPluggedThing::StaticClass()), TPersistentSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TWinControlSprig::StaticClass());
  TSprigIntfType Both{0, {IPlugged::IID, IShown::IID}, TPluggedSprig::StaticClass()};
  EXPECT_TRUE(Both.Match(TPluggedThing::StaticClass()));
  EXPECT_FALSE(Both.Match(THalfPluggedThing::StaticClass()));
  EXPECT_FALSE(Both.Match(TButton::StaticClass())) << "a control made only to be asked";
  // An empty list takes every class, newest interface registration first.
  RegisterSprigType(TGUIDArray{}, TControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TTimer::StaticClass()), TControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TPluggedThing::StaticClass()), TControlSprig::StaticClass());
}

TEST_F(SprigRegistryTest, AMinimumRefusesTheBestAnswerInsteadOfLookingFurther) {
  RegisterSprigType(TButton::StaticClass(), TPluggedSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TPluggedSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass(), TComponentSprig::StaticClass()), nullptr)
      << "the looser TComponent registration would have passed";
  EXPECT_EQ(FindBestSprigClass(TPanel::StaticClass(), TComponentSprig::StaticClass()), TComponentSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TPanel::StaticClass(), nullptr), TComponentSprig::StaticClass());
  // And so the module shows no button.
  IPtr<IRoot> Form1 = NewForm("Form1");
  Add<TButton>(Form1);
  Add<TPanel>(Form1);
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n");
}

TEST_F(SprigRegistryTest, AGroupThatGoesTakesItsRegistrationsAndTheirMemory) {
  const int Saved = CurrentGroup;
  const int Group = NewEditorGroup();
  RegisterSprigType(TButton::StaticClass(), TWinControlSprig::StaticClass());
  RegisterSprigType(TGUIDArray{IPlugged::IID}, TPluggedSprig::StaticClass());
  RegisterRootSprigType(TForm::StaticClass(), TFormSprig::StaticClass());
  CurrentGroup = Saved;
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TWinControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(THalfPluggedThing::StaticClass()), TPluggedSprig::StaticClass());
  IPtr<IRoot> Form1 = NewForm("Form1");
  EXPECT_TRUE(dynamic_cast<TFormSprig*>(RootOf(Form1))) << "a form's tree is of the package's root class";
  Form1->Close();
  EXPECT_EQ(SprigRegistry()->MatchCache(THalfPluggedThing::StaticClass()), TPluggedSprig::StaticClass());

  FreeEditorGroup(Group);
  EXPECT_EQ(SprigRegistry()->MatchCache(THalfPluggedThing::StaticClass()), nullptr);
  EXPECT_EQ(FindBestSprigClass(THalfPluggedThing::StaticClass()), TPersistentSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TButton::StaticClass()), TComponentSprig::StaticClass());
  EXPECT_EQ(FindBestRootSprigClass(TForm::StaticClass()), TRootSprig::StaticClass());
  EXPECT_EQ(SprigRegistry()->Count(), 4) << "the core's own stay";
}

} // namespace
} // namespace formkit::fakes
