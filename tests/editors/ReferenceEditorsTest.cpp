//===- tests/editors/ReferenceEditorsTest.cpp - References, events, variants ===//
#include "tests/editors/EditorSamples.h"

#include <map>

namespace formkit::samples {
namespace {

/// A module whose source keeps methods by name, recording every request the editors make
/// of it as "Form1.<Call>".
class TSourceModule : public fakes::TFakeRoot {
  FK_CLASS(TSourceModule, fakes::TFakeRoot)
  TSourceModule(TComponent* Root, fakes::TCallLog* Log) : TFakeRoot("Form1", Log), FRootComponent(Root) {}

  String RootClassName = "TForm1";
  std::vector<String> Methods;
  std::vector<String> Inherited;

  /// The token of method `Name`, as a generated class would give it.
  void* CodeOf(const String& Name) {
    for (size_t I = 0; I < Methods.size(); ++I)
      if (SameText(Methods[I], Name)) return reinterpret_cast<void*>(I + 1);
    Methods.push_back(Name);
    return reinterpret_cast<void*>(Methods.size());
  }
  TComponent* GetRoot() override { return FRootComponent; }
  String GetRootClassName() override { return RootClassName; }
  TMethod CreateMethod(const String& Name, const TTypeData*) override {
    if (Name.empty()) return {};
    Record("CreateMethod(" + Name + ")");
    return {CodeOf(Name), FRootComponent};
  }
  String GetMethodName(const TMethod& M) override {
    auto Index = reinterpret_cast<std::uintptr_t>(M.Code);
    if (M.Data != static_cast<void*>(static_cast<TObject*>(FRootComponent)) || Index == 0 || Index > Methods.size())
      return "";
    return Methods[Index - 1];
  }
  void GetMethods(const TTypeData*, const TGetStrProc& Proc) override {
    for (const String& M : Methods) Proc(M);
  }
  bool MethodExists(const String& Name) override {
    return std::any_of(Methods.begin(), Methods.end(), [&](const String& M) { return SameText(M, Name); });
  }
  void RenameMethod(const String& CurName, const String& NewName) override {
    Record("RenameMethod(" + CurName + "," + NewName + ")");
    for (String& M : Methods)
      if (SameText(M, CurName)) M = NewName;
  }
  void ShowMethod(const String& Name) override { Record("ShowMethod(" + Name + ")"); }
  void ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                 const TTypeData*) override {
    Record("ChainCall(" + MethodName + "," + InstanceName + "," + InstanceMethod + ")");
  }
  bool MethodFromAncestor(const TMethod& M) override {
    String Name = GetMethodName(M);
    return std::find(Inherited.begin(), Inherited.end(), Name) != Inherited.end() && !Name.empty();
  }
  TComponent* GetComponent(const String& Name) override { return FRootComponent->FindComponent(Name); }
  void GetComponentNames(const TTypeData* TypeData, const TGetStrProc& Proc) override {
    for (int I = 0; I < FRootComponent->ComponentCount(); ++I) {
      TComponent* C = FRootComponent->Components(I);
      if (!C->Name().empty() && C->InheritsFrom(TypeData->ClassRef)) Proc(C->Name());
    }
  }

private:
  TComponent* FRootComponent;
};
FK_IMPLEMENT(TSourceModule, "GadgetUnit") {}

struct ReferenceEditorsTest : EditorFixture {
  IPtr<TSourceModule> Source;
  IPtr<IDesigner> Module;
  void SetUp() override {
    EditorFixture::SetUp();
    Source = New<TSourceModule>(Owner, &Log);
    Module = InterfaceOf<IDesigner>(Source.Get());
  }
  void TearDown() override {
    Module = nullptr;
    Source = nullptr;
    EditorFixture::TearDown();
  }
  std::vector<String> Calls() const { return Log.Calls; }
  static std::vector<String> ValuesOf(const IPtr<IProperty>& P) {
    std::vector<String> Values;
    P->GetValues([&](const String& S) { Values.push_back(S); });
    return Values;
  }
};

TEST_F(ReferenceEditorsTest, AReferenceIsSetByNameOfAComponentOfItsClassAndCleared) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  Make<TOtherGadget>("Other1");
  IPtr<IProperty> Buddy = EditorOf({G}, "Buddy", Module);
  EXPECT_EQ(Buddy->GetValue(), "");
  EXPECT_EQ(ValuesOf(Buddy), (std::vector<String>{"Gadget1", "Gadget2"}));
  Buddy->SetValue("Gadget2");
  EXPECT_EQ(G->FBuddy, H);
  EXPECT_EQ(Buddy->GetValue(), "Gadget2");
  ExpectRejected([&] { Buddy->SetValue("Other1"); }, "Invalid property value");
  ExpectRejected([&] { Buddy->SetValue("Nobody"); }, "Invalid property value");
  EXPECT_EQ(G->FBuddy, H);
  EXPECT_EQ(Buddy->GetEditLimit(), 127);
  // On no design surface the reference does not open.
  EXPECT_FALSE(Buddy->AllEqual());
  EXPECT_EQ(Buddy->GetAttributes(), (TPropertyAttributes{paValueList, paSortList, paRevertable, paMultiSelect}));
  auto* Reference = dynamic_cast<TComponentProperty*>(Buddy.Get());
  EXPECT_FALSE(Reference->GetSelections());
  EXPECT_TRUE(Reference->ShowReferenceProperty());
  // Ctrl with the left button selects what is referred to; else the values are stepped.
  Source->ShiftState = TShiftState{ssCtrl, ssLeft};
  Buddy->Edit();
  EXPECT_EQ(Source->Selected, (std::vector<TPersistent*>{H}));
  Source->ShiftState = TShiftState{ssCtrl};
  Buddy->Edit();
  EXPECT_EQ(G->FBuddy, G);
  Buddy->SetValue("");
  EXPECT_EQ(G->FBuddy, nullptr);
  EXPECT_TRUE(TComponentProperty::FilterFunc(EditorOf({G}, "Count")));
  EXPECT_FALSE(TComponentProperty::FilterFunc(EditorOf({G}, "Name")));
}

TEST_F(ReferenceEditorsTest, AnInterfaceReferenceNamesTheComponentBehindIt) {
  auto* V = Make<TVariantGadget>("Variant1");
  TGadget* G = Make<TGadget>("Gadget1");
  IPtr<IProperty> Link = EditorOf({V}, "Link", Module);
  EXPECT_EQ(GetEditorClass(PropOf(TVariantGadget::StaticClass(), "Link"), V), TInterfaceProperty::StaticClass());
  EXPECT_EQ(ValuesOf(Link), (std::vector<String>{"Variant1", "Gadget1"}));
  Link->SetValue("Gadget1");
  EXPECT_EQ(ReferencedComponent(V->FLink), G);
  EXPECT_EQ(Link->GetValue(), "Gadget1");
  ExpectRejected([&] { Link->SetValue("Gadget9"); }, "Invalid property value");
  EXPECT_EQ(ReferencedComponent(V->FLink), G);
  Link->SetValue("");
  EXPECT_FALSE(V->FLink);
}

TEST_F(ReferenceEditorsTest, AnEmptyEventGetsAHandlerOfTheProposedNameAndIsShown) {
  auto* C = Make<TClicker>("Clicker1");
  IPtr<IProperty> OnClick = EditorOf({C}, "OnClick", Module);
  auto* Method = dynamic_cast<TMethodProperty*>(OnClick.Get());
  EXPECT_EQ(Method->GetTrimmedEventName(), "Click");
  EXPECT_EQ(dynamic_cast<TMethodProperty*>(EditorOf({C}, "Online", Module).Get())->GetTrimmedEventName(), "line");
  EXPECT_EQ(dynamic_cast<TMethodProperty*>(EditorOf({C}, "Click", Module).Get())->GetTrimmedEventName(), "Click");
  EXPECT_EQ(Method->GetFormMethodName(), "Clicker1Click");
  EXPECT_EQ(OnClick->GetAttributes(), (TPropertyAttributes{paValueList, paMultiSelect, paSortList, paRevertable}));
  EXPECT_EQ(OnClick->GetEditLimit(), 63);

  OnClick->Edit();
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.CreateMethod(Clicker1Click)", "Form1.Modified", "Form1.ShowMethod(Clicker1Click)",
                                          "Form1.ShowMethod(Clicker1Click)"}));
  EXPECT_EQ(OnClick->GetValue(), "Clicker1Click");
  // Bound to a handler of its own: shown, nothing created.
  Log.Clear();
  OnClick->Edit();
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.ShowMethod(Clicker1Click)"}));
  // Another case of the same name renames the handler.
  Log.Clear();
  OnClick->SetValue("CLICKER1CLICK");
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.RenameMethod(Clicker1Click,CLICKER1CLICK)"}));
  EXPECT_EQ(OnClick->GetValue(), "CLICKER1CLICK");
}

TEST_F(ReferenceEditorsTest, WritingAnEventBindsRenamesOrUnbinds) {
  auto* C = Make<TClicker>("Clicker1");
  IPtr<IProperty> OnClick = EditorOf({C}, "OnClick", Module);
  Source->Methods = {"Shared", "Clicked"};
  OnClick->SetValue("Shared"); // an existing method: bound, not shown
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.CreateMethod(Shared)", "Form1.Modified"}));
  EXPECT_EQ(OnClick->GetValue(), "Shared");
  EXPECT_EQ(ValuesOf(OnClick), (std::vector<String>{"Shared", "Clicked"}));
  // A name no method has renames the bound one; one that exists binds to it.
  Log.Clear();
  OnClick->SetValue("Fresh");
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.RenameMethod(Shared,Fresh)"}));
  Log.Clear();
  OnClick->SetValue("Clicked");
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.CreateMethod(Clicked)", "Form1.Modified"}));
  // Empty text unbinds; the source keeps the method.
  Log.Clear();
  OnClick->SetValue("");
  EXPECT_FALSE(C->FOnClick.IsAssigned());
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.Modified"}));
  EXPECT_EQ(Source->Methods.size(), 2u);
  // A handler from the ancestor is not renamed: a new one of this module is bound.
  OnClick->SetValue("Clicked");
  Source->Inherited = {"Clicked"};
  Log.Clear();
  OnClick->SetValue("Mine");
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.CreateMethod(Mine)", "Form1.Modified", "Form1.ShowMethod(Mine)"}));
  // And an inherited handler, edited, gets a handler of that name in this module.
  OnClick->SetValue("Clicked");
  Log.Clear();
  OnClick->Edit();
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.CreateMethod(Clicked)", "Form1.Modified", "Form1.ShowMethod(Clicked)"}));
}

TEST_F(ReferenceEditorsTest, ProposedNamesForTheRootForPathsAndForTheUnnamed) {
  auto* Root = CreateComponentOf<TClicker>(nullptr);
  auto FreeRoot = Finally([&]() noexcept { Root->Destroy(); });
  Root->SetName("Form1");
  IPtr<TSourceModule> RootModule = New<TSourceModule>(Root, &Log);
  IPtr<IDesigner> D = InterfaceOf<IDesigner>(RootModule.Get());
  EXPECT_EQ(dynamic_cast<TMethodProperty*>(EditorOf({Root}, "OnClick", D).Get())->GetFormMethodName(), "Form1Click");
  RootModule->RootClassName = "Form1"; // no leading capital T to remove
  EXPECT_EQ(dynamic_cast<TMethodProperty*>(EditorOf({Root}, "OnChange", D).Get())->GetFormMethodName(),
            "Form1Change");
  // An unnamed object anywhere in the selection: no handler can be named.
  auto* Named = Make<TClicker>("Clicker1");
  IPtr<IProperty> Detached = EditorOf({Named}, "OnClick"); // no module, no source: nothing happens
  Detached->SetValue("Anything");
  Detached->Edit();
  EXPECT_FALSE(Named->FOnClick.IsAssigned());
  auto* Unnamed = CreateComponentOf<TClicker>(Owner);
  IPtr<IProperty> Both = EditorOf({Named, Unnamed}, "OnClick", Module);
  ExpectRejected([&] { Both->SetValue("Anything"); }, "Cannot create a method for an unnamed component");
  ExpectRejected([&] { Both->Edit(); }, "Cannot create a method for an unnamed component");
  EXPECT_TRUE(Calls().empty());
}

TEST_F(ReferenceEditorsTest, ANewHandlerChainsToTheMethodOfAnotherComponentItReplaces) {
  auto* C = Make<TClicker>("Clicker1");
  auto* Other = Make<TClicker>("Clicker2");
  C->FOnClick = TPingEvent::Bind<&TClicker::Pressed>(Other);
  IPtr<IProperty> OnClick = EditorOf({C}, "OnClick", Module);
  EXPECT_EQ(OnClick->GetValue(), ""); // not a method of this module
  OnClick->SetValue("Clicker1Click");
  EXPECT_EQ(Calls(), (std::vector<String>{"Form1.CreateMethod(Clicker1Click)", "Form1.Modified",
                                          "Form1.ChainCall(Clicker1Click,Clicker2,Pressed)",
                                          "Form1.ShowMethod(Clicker1Click)"}));
}

TEST_F(ReferenceEditorsTest, AVariantKeepsItsTypeWhenTheTextReadsBackThroughIt) {
  auto* V = Make<TVariantGadget>("Variant1");
  IPtr<IProperty> Value = EditorOf({V}, "Value", Module);
  EXPECT_EQ(Value->GetValue(), "");
  V->FValue = TVariant::Null();
  EXPECT_EQ(Value->GetValue(), "(Null)");
  V->FValue = TVariant(true);
  EXPECT_EQ(Value->GetValue(), "True");
  V->FValue = TVariant(5);
  Value->SetValue("7");
  EXPECT_EQ(V->FValue, TVariant(7));
  Value->SetValue("1.50"); // does not read back through an integer: a string now
  EXPECT_EQ(V->FValue, TVariant(String("1.50")));
  Value->SetValue("(unknown)"); // the text of a value that cannot be edited: left alone
  EXPECT_EQ(V->FValue, TVariant(String("1.50")));
  Value->SetValue("(null)");
  EXPECT_TRUE(V->FValue.IsNull());
  Value->SetValue("");
  EXPECT_TRUE(V->FValue.IsEmpty());

  std::vector<IPtr<IProperty>> Rows;
  Value->GetProperties([&](const IPtr<IProperty>& P) { Rows.push_back(P); });
  ASSERT_EQ(Rows.size(), 1u);
  IPtr<IProperty> Type = Rows[0];
  EXPECT_EQ(Type->GetName(), "Type");
  EXPECT_EQ(Type->GetValue(), "Unassigned");
  EXPECT_EQ(ValuesOf(Type), (std::vector<String>{"Unassigned", "Null", "Smallint", "Integer", "Single", "Double",
                                                  "Currency", "Date", "OleStr", "Boolean", "Shortint", "Byte",
                                                  "Word", "LongWord", "Int64", "String"}));
  V->FValue = TVariant(String("42"));
  EXPECT_EQ(Type->GetValue(), "String");
  Type->SetValue("Integer");
  EXPECT_EQ(V->FValue, TVariant(42));
  V->FValue = TVariant(String("forty-two"));
  Type->SetValue("Integer"); // the cast fails: the cleared value is cast instead
  EXPECT_EQ(V->FValue, TVariant(0));
  Type->SetValue("Null");
  EXPECT_TRUE(V->FValue.IsNull());
  ExpectRejected([&] { Type->SetValue("integer"); }, "Unknown Type"); // names compare exactly
  EXPECT_TRUE(V->FValue.IsNull());
}

} // namespace
} // namespace formkit::samples
