//===- tests/inheritance/FamilyEditingTest.cpp - A family of forms edited by hand ===//
//
// An ancestor form and two generations below it, open at once on the Kiln designer
// and edited as a user edits them: components made and moved by dragging on the
// surface, properties, names, references and events written through the
// inspector's editors, reverted through them, panels of a status bar added and
// changed, children put in another order. After each edit every generation shows
// what it takes from the one above and keeps what it made its own.
//
//===----------------------------------------------------------------------===//
#include "editors/DesignEditors.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

struct FamilyEditingTest : KilnDesignFixture {
  IPtr<IRoot> Form1, Form2, Form3;

  /// Form1 with a button, an edit and a label dragged onto it; Form2 inherits from
  /// it and Form3 from Form2.
  void SetUp() override {
    KilnDesignFixture::SetUp();
    Env->Options.UseDesignerGuidelines = false; // the grid alone, so every drag is exact
    Form1 = NewForm("Form1");
    TKilnSurface* S = KilnSurfaceOf(Form1);
    for (TClass Class : {TButton::StaticClass(), TEdit::StaticClass(), TLabel::StaticClass()}) {
      Arm(Class);
      int Top = 16 + 40 * static_cast<int>(Form1->GetRoot()->ComponentCount());
      Drag(S, {16, Top}, {96, Top + 24});
    }
    Arm(nullptr);
    Form2 = NewDescendant("Form2", "Form1");
    Form3 = NewDescendant("Form3", "Form2");
  }
  void TearDown() override {
    Form1 = Form2 = Form3 = nullptr;
    KilnDesignFixture::TearDown();
  }

  static IPtr<IDesigner> DesignerOf(const IPtr<IRoot>& Form) { return KilnRoot(Form)->AsDesigner(); }
  /// The inspector's editor of `Name` for the component `Component` of `Form`.
  static IPtr<IProperty> PropertyOf(const IPtr<IRoot>& Form, const String& Component, const String& Name) {
    IPtr<IDesignerSelections> One = CreateSelectionList();
    TComponent* Target = Component == Form->GetRootName() ? Form->GetRoot() : Form->GetRoot()->FindComponent(Component);
    EXPECT_NE(Target, nullptr) << Component;
    One->Add(Target);
    IPtr<IProperty> Found;
    GetComponentProperties(One, tkAny, DesignerOf(Form), [&](const IPtr<IProperty>& P) {
      if (SameText(P->GetName(), Name)) Found = P;
    });
    EXPECT_TRUE(Found) << Component << "." << Name;
    return Found;
  }
  static void Write(const IPtr<IRoot>& Form, const String& Component, const String& Name, const String& Value) {
    PropertyOf(Form, Component, Name)->SetValue(Value);
  }
  /// What the inspector shows for `Component.Name` in Form1, Form2 and Form3.
  std::vector<String> Shown(const String& Component, const String& Name) const {
    std::vector<String> Values;
    for (const IPtr<IRoot>& Form : {Form1, Form2, Form3}) Values.push_back(PropertyOf(Form, Component, Name)->GetValue());
    return Values;
  }
  template <class T> static T* Find(const IPtr<IRoot>& Form, const String& Name) {
    return dynamic_cast<T*>(Form->GetRoot()->FindComponent(Name));
  }
  /// The names of the form's controls in their order on it.
  static std::vector<String> ControlOrder(const IPtr<IRoot>& Form) {
    auto* Root = static_cast<TWinControl*>(Form->GetRoot());
    std::vector<String> Names;
    for (int I = 0; I < Root->ControlCount(); ++I) Names.push_back(Root->Controls(I)->Name());
    return Names;
  }
  using Values = std::vector<String>;
};

TEST_F(FamilyEditingTest, APropertyWrittenInTheInspectorReachesEveryGenerationThatDidNotOverrideIt) {
  EXPECT_EQ(Shown("Button1", "Caption"), (Values{"Button1", "Button1", "Button1"}));
  // The middle generation makes the caption its own; the youngest takes it from there.
  Write(Form2, "Button1", "Caption", "Mine");
  EXPECT_EQ(Shown("Button1", "Caption"), (Values{"Button1", "Mine", "Mine"}));
  Write(Form1, "Button1", "Caption", "Go");
  Write(Form1, "Button1", "Hint", "Starts it");
  EXPECT_EQ(Shown("Button1", "Caption"), (Values{"Go", "Mine", "Mine"}));
  EXPECT_EQ(Shown("Button1", "Hint"), (Values{"Starts it", "Starts it", "Starts it"}));
  // Set back by hand to the ancestor's value, it stays the descendant's own...
  Write(Form2, "Button1", "Caption", "Go");
  Write(Form1, "Button1", "Caption", "Run");
  EXPECT_EQ(Shown("Button1", "Caption"), (Values{"Run", "Go", "Go"}));
  // ...until the inspector reverts it, and from then on it follows again.
  IPtr<IProperty> Caption = PropertyOf(Form2, "Button1", "Caption");
  EXPECT_TRUE(Caption->GetAttributes().Contains(paRevertable));
  Caption->Revert();
  EXPECT_EQ(Shown("Button1", "Caption"), (Values{"Run", "Run", "Run"}));
  Write(Form1, "Button1", "Caption", "Walk");
  EXPECT_EQ(Shown("Button1", "Caption"), (Values{"Walk", "Walk", "Walk"}));
  // What the youngest overrides never climbs up.
  Write(Form3, "Edit1", "Text", "typed");
  EXPECT_EQ(Shown("Edit1", "Text"), (Values{"Edit1", "Edit1", "typed"}));
}

TEST_F(FamilyEditingTest, ADragOnTheAncestorsSurfaceMovesTheDescendantsThatDidNotMoveTheirOwn) {
  TKilnSurface* S1 = KilnSurfaceOf(Form1);
  TKilnSurface* S2 = KilnSurfaceOf(Form2);
  // Form2 moves its Edit1 by a grid step; Form1 then moves both its button and its edit.
  KilnRoot(Form2)->SelectComponent(Find<TComponent>(Form2, "Edit1"));
  Drag(S2, {30, 66}, {46, 66});
  EXPECT_EQ(Shown("Edit1", "Left"), (Values{"16", "32", "32"}));
  Drag(S1, {30, 26}, {30, 42}); // Button1 down by two grid steps
  KilnRoot(Form1)->SelectComponent(Find<TComponent>(Form1, "Edit1"));
  Drag(S1, {30, 66}, {30, 82});
  EXPECT_EQ(Shown("Button1", "Top"), (Values{"32", "32", "32"}));
  // Each property follows on its own: Form2 moved its edit sideways only.
  EXPECT_EQ(Shown("Edit1", "Top"), (Values{"72", "72", "72"}));
  EXPECT_EQ(Shown("Edit1", "Left"), (Values{"16", "32", "32"}));
}

TEST_F(FamilyEditingTest, ComponentsMadeRenamedAndDeletedInTheAncestorFollowAndTheDescendantsOwnStay) {
  // Form3 adds a button of its own; the one Form1 then adds by dragging takes a name
  // that no generation uses yet.
  Arm(TButton::StaticClass());
  Drag(KilnSurfaceOf(Form3), {200, 16}, {280, 40});
  auto* Own = Find<TButton>(Form3, "Button2");
  ASSERT_NE(Own, nullptr);
  Drag(KilnSurfaceOf(Form1), {200, 100}, {280, 124});
  Arm(nullptr);
  EXPECT_EQ(Find<TButton>(Form1, "Button2"), nullptr);
  for (const IPtr<IRoot>& Form : {Form1, Form2, Form3}) {
    auto* Made = Find<TButton>(Form, "Button3");
    ASSERT_NE(Made, nullptr) << Form->GetRootName();
    EXPECT_EQ(Made->BoundsRect(), Rect(200, 104, 281, 129)) << Form->GetRootName();
    EXPECT_TRUE(Made->ComponentState().Contains(csAncestor) == (Form != Form1)) << Form->GetRootName();
  }
  EXPECT_FALSE(Own->ComponentState().Contains(csAncestor));
  EXPECT_EQ(Own->BoundsRect(), Rect(200, 16, 281, 41));
  // A rename in the inspector runs down the family; a delete takes the twins along.
  Write(Form1, "Button3", "Name", "OkButton");
  for (const IPtr<IRoot>& Form : {Form1, Form2, Form3}) {
    EXPECT_NE(Find<TButton>(Form, "OkButton"), nullptr) << Form->GetRootName();
    EXPECT_EQ(Find<TButton>(Form, "Button3"), nullptr) << Form->GetRootName();
  }
  Find<TButton>(Form1, "OkButton")->Destroy();
  DesignerOf(Form1)->Modified();
  for (const IPtr<IRoot>& Form : {Form1, Form2, Form3})
    EXPECT_EQ(Find<TButton>(Form, "OkButton"), nullptr) << Form->GetRootName();
  EXPECT_EQ(Find<TButton>(Form3, "Button2"), Own);
}

TEST_F(FamilyEditingTest, ReferencesAndEventsFollowAsTheDescendantsOwnComponentsAndHandlers) {
  // A reference written in the ancestor points at each descendant's own twin.
  Write(Form1, "Label1", "FocusControl", "Edit1");
  for (const IPtr<IRoot>& Form : {Form1, Form2, Form3})
    EXPECT_EQ(Find<TLabel>(Form, "Label1")->FocusControl(), Find<TEdit>(Form, "Edit1")) << Form->GetRootName();
  EXPECT_EQ(Shown("Label1", "FocusControl"), (Values{"Edit1", "Edit1", "Edit1"}));
  // A handler made in the ancestor is the descendants' inherited handler, bound to each.
  Write(Form1, "Button1", "OnClick", "Button1Click");
  EXPECT_EQ(Shown("Button1", "OnClick"), (Values{"Button1Click", "Button1Click", "Button1Click"}));
  for (const IPtr<IRoot>& Form : {Form2, Form3})
    EXPECT_EQ(Find<TButton>(Form, "Button1")->OnClick.Method().Data, static_cast<TObject*>(Form->GetRoot()));
  // Form2 binds its own handler; the ancestor's later choice of another handler does not
  // reach it, nor Form3.
  Write(Form2, "Button1", "OnClick", "Form2Click");
  Write(Form1, "Edit1", "OnChange", "StartClick");
  Write(Form1, "Button1", "OnClick", "StartClick");
  EXPECT_EQ(Shown("Button1", "OnClick"), (Values{"StartClick", "Form2Click", "Form2Click"}));
  // Cleared in the ancestor, the reference goes in every generation that followed it.
  Write(Form3, "Label1", "FocusControl", "");
  Write(Form1, "Label1", "FocusControl", "");
  Write(Form1, "Edit1", "Text", "x"); // another edit: the youngest's own choice stays empty
  EXPECT_EQ(Shown("Label1", "FocusControl"), (Values{"", "", ""}));
}

TEST_F(FamilyEditingTest, ChildOrderFollowsUntilADescendantReordersItsChildren) {
  auto* Root1 = static_cast<TWinControl*>(Form1->GetRoot());
  EXPECT_EQ(ControlOrder(Form2), (Values{"Button1", "Edit1", "Label1"}));
  Root1->BringToFront(Find<TControl>(Form1, "Button1"));
  DesignerOf(Form1)->Modified();
  for (const IPtr<IRoot>& Form : {Form1, Form2, Form3})
    EXPECT_EQ(ControlOrder(Form), (Values{"Edit1", "Label1", "Button1"})) << Form->GetRootName();
  // Form2 sends its Label1 to the back; the ancestor's next reorder leaves that one be.
  static_cast<TWinControl*>(Form2->GetRoot())->SendToBack(Find<TControl>(Form2, "Label1"));
  DesignerOf(Form2)->Modified();
  EXPECT_EQ(ControlOrder(Form3), (Values{"Label1", "Edit1", "Button1"}));
  Root1->SendToBack(Find<TControl>(Form1, "Button1"));
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(ControlOrder(Form1), (Values{"Button1", "Edit1", "Label1"}));
  // Button1 still follows to the back; Label1 and Edit1 keep the order Form2 gave them.
  EXPECT_EQ(ControlOrder(Form2), (Values{"Button1", "Label1", "Edit1"}));
  EXPECT_EQ(ControlOrder(Form3), ControlOrder(Form2));
}

TEST_F(FamilyEditingTest, StatusPanelsFollowAsOneCollectionUntilADescendantEditsThem) {
  Arm(TStatusBar::StaticClass());
  Drag(KilnSurfaceOf(Form1), {200, 200}, {200, 200});
  Arm(nullptr);
  auto Panels = [](const IPtr<IRoot>& Form) {
    std::vector<String> Texts;
    TStatusPanels* List = Find<TStatusBar>(Form, "StatusBar1")->Panels();
    for (int I = 0; I < List->Count(); ++I) Texts.push_back(List->Items(I)->Text() + ":" + IntToStr(List->Items(I)->Width()));
    return Texts;
  };
  TStatusPanels* Panels1 = Find<TStatusBar>(Form1, "StatusBar1")->Panels();
  Panels1->Add()->SetText("Ready");
  Panels1->Add()->SetText("Line 1");
  DesignerOf(Form1)->Modified();
  for (const IPtr<IRoot>& Form : {Form2, Form3}) EXPECT_EQ(Panels(Form), (Values{"Ready:50", "Line 1:50"}));
  // Form2 widens its first panel: from then on its panels are its own, and Form3's follow Form2's.
  Find<TStatusBar>(Form2, "StatusBar1")->Panels()->Items(0)->SetWidth(120);
  DesignerOf(Form2)->Modified();
  Panels1->Add()->SetText("Insert");
  Panels1->Items(0)->SetText("Busy");
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(Panels(Form1), (Values{"Busy:50", "Line 1:50", "Insert:50"}));
  EXPECT_EQ(Panels(Form2), (Values{"Ready:120", "Line 1:50"}));
  EXPECT_EQ(Panels(Form3), (Values{"Ready:120", "Line 1:50"}));
  // The bar's other properties still follow.
  Write(Form1, "StatusBar1", "SimpleText", "Welcome");
  EXPECT_EQ(Shown("StatusBar1", "SimpleText"), (Values{"Welcome", "Welcome", "Welcome"}));
}

TEST_F(FamilyEditingTest, AnIconsPlaceIsADefinedPropertyThatFollowsLikeAnyOther) {
  Arm(TTimer::StaticClass());
  Drag(KilnSurfaceOf(Form1), {300, 100}, {300, 100});
  Arm(nullptr);
  auto Place = [](const IPtr<IRoot>& Form) {
    std::int32_t Info = Find<TTimer>(Form, "Timer1")->DesignInfo();
    return IntToStr(static_cast<std::int16_t>(Info & 0xFFFF)) + "," + IntToStr(static_cast<std::int16_t>(Info >> 16));
  };
  String Made = Place(Form1);
  EXPECT_EQ(Place(Form2), Made);
  EXPECT_EQ(Place(Form3), Made);
  // The icon dragged on Form1's surface moves in both descendants.
  IPtr<IItem> Icon = KilnRoot(Form1)->Surface()->ItemFromComponent(Find<TTimer>(Form1, "Timer1"));
  TRect At = Icon->GetBoundsRect();
  Drag(KilnSurfaceOf(Form1), {At.Left + 4, At.Top + 4}, {At.Left + 4 + 32, At.Top + 4});
  String Moved = Place(Form1);
  EXPECT_NE(Moved, Made);
  EXPECT_EQ(Place(Form2), Moved);
  EXPECT_EQ(Place(Form3), Moved);
  // Once Form2 has placed its icon itself, the ancestor's next move stays in Form1.
  Find<TTimer>(Form2, "Timer1")->SetDesignInfo(10 | (10 << 16));
  DesignerOf(Form2)->Modified();
  At = Icon->GetBoundsRect();
  Drag(KilnSurfaceOf(Form1), {At.Left + 4, At.Top + 4}, {At.Left + 4, At.Top + 4 + 32});
  EXPECT_NE(Place(Form1), Moved);
  EXPECT_EQ(Place(Form2), "10,10");
  EXPECT_EQ(Place(Form3), "10,10");
}

} // namespace
