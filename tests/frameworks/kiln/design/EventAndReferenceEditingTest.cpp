//===- tests/frameworks/kiln/design/EventAndReferenceEditingTest.cpp - Editors on a module at work ===//
//
// The inspector's editors on a Kiln form on design, with the recording host: a double
// click on a component opens the event a user wants and the host is asked to create
// and show the handler; event and reference properties are written by name.
//
//===----------------------------------------------------------------------===//
#include "editors/DesignEditors.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

struct EventAndReferenceEditingTest : KilnDesignFixture {
  IPtr<IRoot> Root;
  IPtr<TRecordingModule> Module;
  TKilnRoot* Kiln = nullptr;
  IPtr<IDesigner> Designer;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Root = NewForm("Form1", &Module);
    Kiln = KilnRoot(Root);
    Designer = Kiln->AsDesigner();
  }
  void TearDown() override {
    Designer = nullptr;
    Root = nullptr;
    Module = nullptr;
    KilnDesignFixture::TearDown();
  }
  template <class T> T* Make() {
    return static_cast<T*>(Kiln->CreateComponent(T::StaticClass(), Root->GetRoot(), 8, 8, 75, 25));
  }
  /// The editor of `Name` for `Obj`, as the inspector lists it.
  IPtr<IProperty> PropertyOf(TPersistent* Obj, const String& Name) {
    IPtr<IDesignerSelections> One = CreateSelectionList();
    One->Add(Obj);
    IPtr<IProperty> Found;
    GetComponentProperties(One, tkAny, Designer, [&](const IPtr<IProperty>& P) {
      if (SameText(P->GetName(), Name)) Found = P;
    });
    return Found;
  }
  /// The host's source requests, in order.
  std::vector<String> SourceRequests() const {
    std::vector<String> Requests;
    for (const String& C : Log.Calls)
      for (const char* Kind : {"CreateMethod(", "RenameMethod(", "ShowMethod(", "ChainCall("})
        if (C.rfind(Kind, 0) == 0) Requests.push_back(C);
    return Requests;
  }
};

TEST_F(EventAndReferenceEditingTest, ADoubleClickOnAButtonCreatesAndShowsItsClickHandler) {
  auto* Button = Make<TButton>();
  ASSERT_EQ(Button->Name(), "Button1");
  Log.Clear();
  Designer->Edit(Button);
  EXPECT_EQ(SourceRequests(), (std::vector<String>{"CreateMethod(Button1Click)", "ShowMethod(Button1Click)",
                                                   "ShowMethod(Button1Click)"}));
  EXPECT_EQ(Designer->GetMethodName(Button->OnClick.Method()), "Button1Click");
  EXPECT_EQ(PropertyOf(Button, "OnClick")->GetValue(), "Button1Click");
  // A second double click shows the handler it has.
  Log.Clear();
  Designer->Edit(Button);
  EXPECT_EQ(SourceRequests(), (std::vector<String>{"ShowMethod(Button1Click)"}));
  // The form itself proposes its own name.
  Log.Clear();
  Designer->Edit(Root->GetRoot());
  EXPECT_EQ(SourceRequests(), (std::vector<String>{"CreateMethod(Form1Click)", "ShowMethod(Form1Click)",
                                                   "ShowMethod(Form1Click)"}));
}

TEST_F(EventAndReferenceEditingTest, AnEditPrefersItsChangeEventAndEventsAreBoundByName) {
  auto* Edit = Make<TEdit>();
  auto* Button = Make<TButton>();
  Designer->SelectComponent(Edit); // a double click selects what it lands on
  Log.Clear();
  Designer->Edit(Edit);
  ASSERT_FALSE(SourceRequests().empty());
  EXPECT_EQ(SourceRequests().front(), "CreateMethod(Edit1Change)");
  // Binding the button's click to the edit's handler shares the method, with no new source.
  Log.Clear();
  PropertyOf(Button, "OnClick")->SetValue("Edit1Change");
  EXPECT_EQ(Button->OnClick.Method(), Edit->OnChange.Method());
  // Another name for a bound handler is a rename of the method in the source.
  Log.Clear();
  PropertyOf(Button, "OnClick")->SetValue("TextChanged");
  EXPECT_EQ(SourceRequests(), (std::vector<String>{"RenameMethod(Edit1Change,TextChanged)"}));
}

TEST_F(EventAndReferenceEditingTest, AReferenceListsTheLinkableComponentsOfItsClassAndIsSetByName) {
  auto* Label = Make<TLabel>();
  auto* Edit = Make<TEdit>();
  Make<TButton>();
  IPtr<IProperty> Focus = PropertyOf(Label, "FocusControl");
  std::vector<String> Values;
  Focus->GetValues([&](const String& S) { Values.push_back(S); });
  EXPECT_EQ(Values, (std::vector<String>{"Edit1", "Button1"}));
  Focus->SetValue("Edit1");
  EXPECT_EQ(Label->FocusControl(), Edit);
  EXPECT_EQ(Focus->GetValue(), "Edit1");
  // On a design surface the reference opens onto the referenced component, without its name.
  EXPECT_TRUE(Focus->GetAttributes().Contains(paSubProperties));
  std::vector<String> Nested;
  Focus->GetProperties([&](const IPtr<IProperty>& P) { Nested.push_back(P->GetName()); });
  EXPECT_EQ(std::count(Nested.begin(), Nested.end(), "Name"), 0);
  EXPECT_EQ(std::count(Nested.begin(), Nested.end(), "OnChange"), 1);
  try {
    Focus->SetValue("Label1"); // not a windowed control
    ADD_FAILURE();
  } catch (const EDesignPropertyError& E) {
    EXPECT_EQ(E.Message(), "Invalid property value");
  }
  EXPECT_EQ(Label->FocusControl(), Edit);
  Focus->SetValue("");
  EXPECT_EQ(Label->FocusControl(), nullptr);
}

TEST_F(EventAndReferenceEditingTest, AReferenceReachesIntoALinkedModuleByItsQualifiedName) {
  auto* Label = Make<TLabel>();
  IPtr<IRoot> Form2 = NewForm("Form2");
  auto* Other = static_cast<TEdit*>(KilnRoot(Form2)->CreateComponent(TEdit::StaticClass(), Form2->GetRoot(), 8, 8, 75, 25));
  IPtr<IProperty> Focus = PropertyOf(Label, "FocusControl");
  std::vector<String> Values;
  Focus->GetValues([&](const String& S) { Values.push_back(S); });
  EXPECT_TRUE(Values.empty()); // Form2 is not linked yet
  Module->LinkedModules = {"Form2"};
  Focus->GetValues([&](const String& S) { Values.push_back(S); });
  EXPECT_EQ(Values, (std::vector<String>{"Form2", "Form2.Edit1"})); // a linked module's root is offered too
  Focus->SetValue("Form2.Edit1");
  EXPECT_EQ(Label->FocusControl(), Other);
  EXPECT_EQ(Focus->GetValue(), "Form2.Edit1");
  Focus->SetValue("");
}

} // namespace
