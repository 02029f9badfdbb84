//===- tests/inheritance/UpdateManagerTest.cpp - Ancestor changes reach descendants ---===//
//
// Opens an ancestor form, a descendant of it and a descendant of that on the
// Kiln designer at once, with the real update managers the Kiln package
// installs, and checks that what changes in the ancestor reaches the
// descendants: properties they did not override, components added, deleted and
// renamed, and reverts; that a descendant's own work survives; that refused
// ancestors say why; and how a run guards itself and reports failures.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"
#include "inheritance/UpdateManager.h"
#include "platform/ScopeGuard.h"
#include "platform/TypInfo.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include <gtest/gtest.h>

namespace formkit::fakes {
namespace {

struct UpdateManagerTest : KilnDesignFixture {
  template <class T> T* Add(const IPtr<IRoot>& Root, TComponent* Parent = nullptr) {
    return static_cast<T*>(
        KilnRoot(Root)->CreateComponent(T::StaticClass(), Parent ? Parent : Root->GetRoot(), 8, 8, 75, 25));
  }
  static TButton* ButtonOf(const IPtr<IRoot>& Root, const char* Name) {
    return dynamic_cast<TButton*>(Root->GetRoot()->FindComponent(Name));
  }
  static TUpdateManager* ManagerOf(const IPtr<IRoot>& Root) {
    return TUpdateManager::ManagerOf(QueryAs<IInterface>(QueryAs<IInternalRoot>(Root)->GetUpdateManager()));
  }
  static PPropInfo Prop(TObject* Instance, const char* Name) { return GetPropInfo(Instance, Name); }

  /// Form1 with "Button1" captioned "Start", Form2 descending from it, Form3 from Form2.
  void OpenFamily() {
    Form1 = NewForm("Form1");
    Add<TButton>(Form1)->SetCaption("Start");
    Form2 = NewDescendant("Form2", "Form1");
    Form3 = NewDescendant("Form3", "Form2");
  }
  IPtr<IRoot> Form1, Form2, Form3;
};

TEST_F(UpdateManagerTest, TheManagersOfAFamilyFormATreeFromTheOldestModule) {
  OpenFamily();
  TUpdateManager* M1 = ManagerOf(Form1);
  TUpdateManager* M2 = ManagerOf(Form2);
  TUpdateManager* M3 = ManagerOf(Form3);
  ASSERT_TRUE(M1 && M2 && M3);
  EXPECT_EQ(M1->Parent(), nullptr);
  EXPECT_EQ(M2->Parent(), M1);
  EXPECT_EQ(M3->Parent(), M2);
  EXPECT_EQ(M1->Children(), std::vector<TUpdateManager*>{M2});
  EXPECT_TRUE(M1->GetHasDescendents());
  EXPECT_FALSE(M3->GetHasDescendents());
  EXPECT_FALSE(M1->GetIsDescendent());
  EXPECT_TRUE(M3->GetIsDescendent());
  EXPECT_EQ(M1->ComponentUpdate(), nullptr); // no ancestor: nothing to follow
  EXPECT_EQ(M2->GetAncestor(), Form1->GetRoot());
  // What the descendants copied counts as inherited.
  ASSERT_NE(ButtonOf(Form3, "Button1"), nullptr);
  EXPECT_TRUE(ButtonOf(Form3, "Button1")->ComponentState().Contains(csAncestor));
  EXPECT_EQ(ButtonOf(Form3, "Button1")->Caption(), "Start");

  // A module without an ancestor filters and answers, doing nothing.
  M1->Filter();
  EXPECT_FALSE(M1->CanRevert(ButtonOf(Form1, "Button1"), Prop(ButtonOf(Form1, "Button1"), "Caption")));

  // The middle module closes first: the youngest stays usable, without a parent.
  Form2->Close();
  EXPECT_EQ(M3->Parent(), nullptr);
  EXPECT_TRUE(M1->Children().empty());
  EXPECT_FALSE(M1->GetHasDescendents());
}

TEST_F(UpdateManagerTest, AnAncestorsChangeReachesEveryDescendantThatDidNotOverrideIt) {
  OpenFamily();
  TButton* Own3 = ButtonOf(Form3, "Button1");
  Own3->SetCaption("Mine"); // the youngest overrides the caption
  KilnRoot(Form3)->Modified();

  TButton* Top = ButtonOf(Form1, "Button1");
  Top->SetCaption("Go");
  Top->SetLeft(40);
  KilnRoot(Form1)->Modified();

  EXPECT_EQ(ButtonOf(Form2, "Button1")->Caption(), "Go");
  EXPECT_EQ(ButtonOf(Form2, "Button1")->Left(), 40);
  EXPECT_EQ(Own3->Caption(), "Mine"); // its own edit kept
  EXPECT_EQ(Own3->Left(), 40);        // what it did not touch still follows, two levels down

  // The middle module's own change reaches the youngest too.
  ButtonOf(Form2, "Button1")->SetTop(60);
  KilnRoot(Form2)->Modified();
  EXPECT_EQ(Own3->Top(), 60);
  EXPECT_EQ(Top->Top(), 8); // never upward
}

TEST_F(UpdateManagerTest, RevertPutsAnOverrideBackToTheAncestorsValue) {
  OpenFamily();
  TButton* Own3 = ButtonOf(Form3, "Button1");
  Own3->SetCaption("Mine");
  KilnRoot(Form3)->Modified();
  ButtonOf(Form1, "Button1")->SetCaption("Go");
  KilnRoot(Form1)->Modified();
  ASSERT_EQ(Own3->Caption(), "Mine");

  PPropInfo Caption = Prop(Own3, "Caption");
  EXPECT_TRUE(KilnRoot(Form3)->CanRevert(Own3, Caption));
  KilnRoot(Form3)->Revert(Own3, Caption);
  EXPECT_EQ(Own3->Caption(), "Go");
  // It follows again from now on.
  ButtonOf(Form1, "Button1")->SetCaption("Again");
  KilnRoot(Form1)->Modified();
  EXPECT_EQ(Own3->Caption(), "Again");

  // A component of the module's own has no ancestor value to go back to.
  TButton* Own = Add<TButton>(Form3);
  EXPECT_FALSE(KilnRoot(Form3)->CanRevert(Own, Prop(Own, "Caption")));
  EXPECT_FALSE(ManagerOf(Form3)->CanRevert(Own, Prop(Own, "Caption")));
}

TEST_F(UpdateManagerTest, AComponentAddedToTheAncestorAppearsInEachDescendant) {
  OpenFamily();
  TButton* Own2 = Add<TButton>(Form2); // the middle module's own: "Button2"
  ASSERT_EQ(Own2->Name(), "Button2");
  Own2->SetCaption("Own");
  KilnRoot(Form2)->Modified();

  auto* Panel = Add<TPanel>(Form1);
  TButton* Inner = Add<TButton>(Form1, Panel); // the names of the descendants are taken
  EXPECT_EQ(Inner->Name(), "Button3");
  Inner->SetCaption("Inner");
  KilnRoot(Form1)->Modified();

  for (const IPtr<IRoot>& Form : {Form2, Form3}) {
    SCOPED_TRACE(Form->GetRootName());
    auto* P = dynamic_cast<TPanel*>(Form->GetRoot()->FindComponent("Panel1"));
    TButton* B = ButtonOf(Form, "Button3");
    ASSERT_NE(P, nullptr);
    ASSERT_NE(B, nullptr);
    EXPECT_TRUE(P->ComponentState().Contains(csAncestor));
    EXPECT_TRUE(B->ComponentState().Contains(csAncestor));
    EXPECT_EQ(B->GetParentComponent(), P); // under the twin of its parent
    EXPECT_EQ(B->Owner(), Form->GetRoot());
    EXPECT_EQ(B->Caption(), "Inner");
    // Once only: a later change finds the pair and does not create again.
    EXPECT_EQ(Form->GetRoot()->ComponentCount(), 4);
  }
  // The middle module is the youngest's ancestor: its own button reached the youngest.
  ASSERT_NE(ButtonOf(Form3, "Button2"), nullptr);
  EXPECT_TRUE(ButtonOf(Form3, "Button2")->ComponentState().Contains(csAncestor));
  EXPECT_EQ(ButtonOf(Form3, "Button2")->Caption(), "Own");
  // The new components follow from now on.
  Inner->SetCaption("Later");
  KilnRoot(Form1)->Modified();
  EXPECT_EQ(ButtonOf(Form3, "Button3")->Caption(), "Later");
  EXPECT_EQ(Form3->GetRoot()->ComponentCount(), 4);
  // The middle module's own component survived it all, and did not reach the ancestor.
  EXPECT_EQ(ButtonOf(Form2, "Button2"), Own2);
  EXPECT_EQ(Own2->Caption(), "Own");
  EXPECT_EQ(Form1->GetRoot()->FindComponent("Button2"), nullptr);
}

TEST_F(UpdateManagerTest, AComponentDeletedInTheAncestorVanishesFromTheDescendants) {
  OpenFamily();
  TButton* Own2 = Add<TButton>(Form2);
  // The handles of the middle module stand on the inherited button that will go.
  KilnRoot(Form2)->SelectComponent(ButtonOf(Form2, "Button1"));
  IPtr<IGrabHandles> Handles = KilnRoot(Form2)->Surface()->GetGrabHandles();
  ASSERT_TRUE(Handles->GetAttachedItem());

  ButtonOf(Form1, "Button1")->Destroy();
  KilnRoot(Form1)->Modified();

  EXPECT_EQ(ButtonOf(Form2, "Button1"), nullptr);
  EXPECT_EQ(ButtonOf(Form3, "Button1"), nullptr);
  EXPECT_FALSE(Handles->GetAttachedItem());
  EXPECT_EQ(ButtonOf(Form2, "Button2"), Own2); // its own stays
  // The trees forgot the freed components: another change runs clean.
  ButtonOf(Form2, "Button2")->SetCaption("Still");
  KilnRoot(Form1)->Modified();
  KilnRoot(Form2)->Modified();
  EXPECT_EQ(Own2->Caption(), "Still");
}

TEST_F(UpdateManagerTest, ARenameInTheAncestorRunsDownTheFamily) {
  OpenFamily();
  TButton* Own3 = Add<TButton>(Form3); // Button2, the youngest's own
  ButtonOf(Form1, "Button1")->SetName("OkButton");
  EXPECT_NE(ButtonOf(Form2, "OkButton"), nullptr);
  EXPECT_NE(ButtonOf(Form3, "OkButton"), nullptr);
  EXPECT_EQ(ButtonOf(Form3, "Button1"), nullptr);
  EXPECT_EQ(Own3->Name(), "Button2");
  // The names of a family are one: the ancestor cannot take a descendant's.
  EXPECT_TRUE(ManagerOf(Form1)->NameExists("Button2"));
  EXPECT_FALSE(ManagerOf(Form2)->NameExists("Nothing"));
  try {
    ButtonOf(Form1, "OkButton")->SetName("Button2");
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "A component named Button2 already exists in a descendant module");
  }
  // A descendant may not rename what it inherited.
  try {
    ButtonOf(Form2, "OkButton")->SetName("Other");
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Cannot rename component OkButton, component was introduced in an ancestor form");
  }
}

TEST_F(UpdateManagerTest, AnAncestorThatCannotBeInheritedFromSaysWhy) {
  Form1 = NewForm("Form1");
  IPtr<IRoot> Other = NewForm("Other");
  TButton* Lone = Add<TButton>(Form1);
  Lone->SetComponentStyle(Lone->ComponentStyle() - TComponentStyle{csInheritable});
  ASSERT_TRUE(TRootHooks::ValidateInheritence); // the Kiln package installed it
  auto Refused = [&](const char* Expected) {
    try {
      TRootHooks::ValidateInheritence(*KilnRoot(Other), Form1->GetRoot());
      FAIL() << "not refused";
    } catch (const EComponentDesignerException& E) {
      EXPECT_EQ(E.Message(), Expected);
    }
  };
  Refused("Cannot inherit from 'Form1'.  Contains a component 'Button1' that does not support inheritance");
  TButton* Second = Add<TButton>(Form1);
  Second->SetComponentStyle(Second->ComponentStyle() - TComponentStyle{csInheritable});
  Refused("Cannot inherit from 'Form1'.  Contains components 'Button1,Button2' that do not support inheritance");
  // Opening a descendant is refused the same way, and no module is left half made.
  int Roots = Designer->GetRootsCount();
  try {
    NewDescendant("Form2", "Form1");
    FAIL() << "a descendant was made";
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(),
              "Cannot inherit from 'Form1'.  Contains components 'Button1,Button2' that do not support inheritance");
  }
  EXPECT_EQ(Designer->GetRootsCount(), Roots);
  EXPECT_EQ(ManagerOf(Form1)->Children().size(), 0u);

  Lone->Destroy();
  Second->Destroy();
  TComponent* Unnamed = CreateComponent(TTimer::StaticClass(), Form1->GetRoot());
  Refused("Cannot inherit from form 'Form1'. It contains a component with a blank name property");
  Unnamed->Destroy();
  // The ancestor now takes a descendant.
  TRootHooks::ValidateInheritence(*KilnRoot(Other), Form1->GetRoot());
  Form2 = NewDescendant("Form2", "Form1");
  EXPECT_EQ(ManagerOf(Form2)->Parent(), ManagerOf(Form1));
}

/// A button that leaves the updating state and then complains, noting its name.
class TStubbornButton : public TButton {
  FK_CLASS(TStubbornButton, TButton)
  static inline std::vector<String> Released;
  void Updated() override {
    inherited::Updated();
    Released.push_back(Name());
    throw EComponentError("cannot release " + Name());
  }
};
FK_IMPLEMENT(TStubbornButton, "UpdateManagerTest") {}

TEST_F(UpdateManagerTest, ARunReleasesEveryTouchedComponentAndReportsTheFirstFailure) {
  TObjectGuard<TForm> Ancestor(CreateComponentOf<TForm>(nullptr));
  TObjectGuard<TForm> Descendant(CreateComponentOf<TForm>(nullptr));
  for (TForm* Form : {Ancestor.Get(), Descendant.Get()})
    for (const char* Name : {"Button1", "Button2"}) {
      auto* Button = CreateComponentOf<TStubbornButton>(Form);
      Button->SetName(Name);
      Button->SetParent(Form);
    }
  for (int I = 0; I < Descendant->ComponentCount(); ++I) Descendant->Components(I)->SetAncestor(true);
  IPtr<TUpdateManager> Manager =
      New<TUpdateManager>(Descendant.Get(), Ancestor.Get(), nullptr, IPtr<IUpdateManagerCallback>());
  TStubbornButton::Released.clear();
  static_cast<TButton*>(Ancestor->FindComponent("Button1"))->SetCaption("Go");
  try {
    Manager->Update();
    FAIL();
  } catch (const Exception& E) {
    // Released from the last touched to the first; the first failure is the message.
    EXPECT_EQ(E.Message(), "cannot release Button1");
  }
  EXPECT_EQ(TStubbornButton::Released, (std::vector<String>{"Button1", "Button2"}));
  EXPECT_EQ(static_cast<TButton*>(Descendant->FindComponent("Button1"))->Caption(), "Go");
  for (TComponent* C : {static_cast<TComponent*>(Descendant.Get()), Descendant->FindComponent("Button2")})
    EXPECT_FALSE(C->ComponentState().Contains(csUpdating)) << C->Name();
  EXPECT_EQ(Manager->Mode(), umNone);
}

/// Tries to run its manager again from inside a run, and stops the run when asked.
class TUpdateProbe : public TObject {
  FK_CLASS(TUpdateProbe, TObject)
  TUpdateManager* Manager = nullptr;
  int Runs = 0;
  bool Raise = false;
  void Updating(TObject*) {
    ++Runs;
    EXPECT_EQ(Manager->Mode(), umUpdate);
    Manager->Update(); // dropped, not deferred
    Manager->Filter(); // likewise
    if (Raise) throw EComponentError("stop");
  }
};
FK_IMPLEMENT(TUpdateProbe, "UpdateManagerTest") {}

TEST_F(UpdateManagerTest, ARunIsNotReenteredAndRunsOnceAnExceptionHasPassed) {
  OpenFamily();
  TUpdateManager* M2 = ManagerOf(Form2);
  TObjectGuard<TUpdateProbe> Probe(new TUpdateProbe);
  Probe->Manager = M2;
  M2->FOnUpdating = TNotifyEvent::Bind<&TUpdateProbe::Updating>(Probe.Get());
  auto Clear = Finally([M2]() noexcept { M2->FOnUpdating = TNotifyEvent(); });
  M2->Update();
  EXPECT_EQ(Probe->Runs, 1);
  Probe->Raise = true;
  EXPECT_THROW(M2->Update(), EComponentError);
  EXPECT_EQ(M2->Mode(), umNone);
  Probe->Raise = false;
  ButtonOf(Form1, "Button1")->SetCaption("After");
  M2->Update();
  EXPECT_EQ(ButtonOf(Form2, "Button1")->Caption(), "After");
}

} // namespace
} // namespace formkit::fakes
