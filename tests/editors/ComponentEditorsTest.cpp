//===- tests/editors/ComponentEditorsTest.cpp - Default actions and verbs --===//
#include "tests/editors/EditorSamples.h"

namespace formkit::samples {
namespace {

/// An event editor that records which event was edited instead of asking a module.
class TRecordingMethodProperty : public TMethodProperty {
  FK_CLASS(TRecordingMethodProperty, TMethodProperty)
  void Edit() override { Edited.push_back(GetName()); }
  static inline std::vector<String> Edited;
};
FK_IMPLEMENT(TRecordingMethodProperty, "GadgetUnit") {}

/// Two verbs; counts what ran.
class TTwoVerbEditor : public TComponentEditor {
  FK_CLASS(TTwoVerbEditor, TComponentEditor)
  int GetVerbCount() override { return 2; }
  String GetVerb(int Index) override { return Index == 0 ? "First" : "Second"; }
  void ExecuteVerb(int Index) override { Ran.push_back(Index); }
  static inline std::vector<int> Ran;
};
FK_IMPLEMENT(TTwoVerbEditor, "GadgetUnit") {}

class TOtherEditor : public TComponentEditor {
  FK_CLASS(TOtherEditor, TComponentEditor)
};
FK_IMPLEMENT(TOtherEditor, "GadgetUnit") {}

/// Stops the search at the first property it is offered.
class TStoppingEditor : public TDefaultEditor {
  FK_CLASS(TStoppingEditor, TDefaultEditor)
  void EditProperty(const IPtr<IProperty>&, bool& Continue) override { Continue = false; }
};
FK_IMPLEMENT(TStoppingEditor, "GadgetUnit") {}

struct ComponentEditorsTest : EditorFixture {
  void SetUp() override {
    EditorFixture::SetUp();
    TRecordingMethodProperty::Edited.clear();
    TTwoVerbEditor::Ran.clear();
    RegisterPropertyEditor(FK_TypeInfo(static_cast<const TPingEvent*>(nullptr)), nullptr, "",
                           TRecordingMethodProperty::StaticClass());
  }
  static TClass EditorClassOf(TComponent* C) {
    IPtr<IComponentEditor> E = GetComponentEditor(C, nullptr);
    return dynamic_cast<TObject*>(static_cast<IInterface*>(E.Get()))->ClassType();
  }
};

TEST_F(ComponentEditorsTest, TheMostDerivedRegistrationWinsAndTheNewestOfOneClass) {
  TGadget* G = Make<TGadget>("Gadget1");
  TShyGadget* Shy = Make<TShyGadget>("Shy1");
  EXPECT_EQ(EditorClassOf(G), TDefaultEditor::StaticClass());
  EXPECT_TRUE(QueryAs<IDefaultEditor>(GetComponentEditor(G, nullptr)));
  RegisterComponentEditor(TShyGadget::StaticClass(), TOtherEditor::StaticClass());
  RegisterComponentEditor(TGadget::StaticClass(), TTwoVerbEditor::StaticClass());
  EXPECT_EQ(EditorClassOf(G), TTwoVerbEditor::StaticClass());
  EXPECT_EQ(EditorClassOf(Shy), TOtherEditor::StaticClass());
  RegisterComponentEditor(TGadget::StaticClass(), TOtherEditor::StaticClass());
  EXPECT_EQ(EditorClassOf(G), TOtherEditor::StaticClass());
  // A registration for the persistent base never takes effect.
  RegisterComponentEditor(TPersistent::StaticClass(), TTwoVerbEditor::StaticClass());
  EXPECT_EQ(EditorClassOf(Make<TClicker>("Clicker1")), TDefaultEditor::StaticClass());
}

TEST_F(ComponentEditorsTest, AnEditorRunsItsFirstVerbAndKnowsItsComponent) {
  TGadget* G = Make<TGadget>("Gadget1");
  RegisterComponentEditor(TGadget::StaticClass(), TTwoVerbEditor::StaticClass());
  IPtr<IComponentEditor> E = GetComponentEditor(G, Designer());
  EXPECT_EQ(E->GetComponent(), G);
  EXPECT_EQ(E->GetDesigner(), Designer());
  EXPECT_EQ(E->GetVerbCount(), 2);
  EXPECT_EQ(E->GetVerb(1), "Second");
  E->Edit();
  E->ExecuteVerb(1);
  EXPECT_EQ(TTwoVerbEditor::Ran, (std::vector<int>{0, 1}));
  EXPECT_FALSE(E->IsInInlined());
  Owner->SetInline(true);
  EXPECT_TRUE(E->IsInInlined());
  Owner->SetInline(false);
  // The base has no verbs: its default action does nothing.
  RegisterComponentEditor(TGadget::StaticClass(), TOtherEditor::StaticClass());
  IPtr<IComponentEditor> Plain = GetComponentEditor(G, nullptr);
  EXPECT_EQ(Plain->GetVerbCount(), 0);
  EXPECT_EQ(Plain->GetVerb(0), "");
  Plain->Edit();
}

TEST_F(ComponentEditorsTest, TheDefaultEditorOpensTheEventAUserMostLikelyWants) {
  auto EditOf = [&](TComponent* C) {
    TRecordingMethodProperty::Edited.clear();
    GetComponentEditor(C, nullptr)->Edit();
    return TRecordingMethodProperty::Edited;
  };
  // OnChange beats OnClick, though OnClick comes later by name.
  EXPECT_EQ(EditOf(Make<TClicker>("Clicker1")), (std::vector<String>{"OnChange"}));
  // OnCreate beats the first event by name.
  EXPECT_EQ(EditOf(Make<TCreator>("Creator1")), (std::vector<String>{"OnCreate"}));
  // None preferred: the first event by name.
  EXPECT_EQ(EditOf(Make<TDropper>("Dropper1")), (std::vector<String>{"OnDrop"}));
  // No events: nothing.
  EXPECT_TRUE(EditOf(Make<TOtherGadget>("Other1")).empty());
  // A descendant that stops the search stops the edit too.
  RegisterComponentEditor(TClicker::StaticClass(), TStoppingEditor::StaticClass());
  EXPECT_TRUE(EditOf(Make<TClicker>("Clicker2")).empty());
}

} // namespace
} // namespace formkit::samples
