//===- tests/editors/EnumerationTest.cpp - The inspector's view of a selection ===//
#include "tests/editors/EditorSamples.h"

namespace formkit::samples {
namespace {

using EnumerationTest = EditorFixture;

const std::vector<String> GadgetProperties = {"Big",   "Buddy", "Caption", "Count", "Digit",  "Fixed",
                                              "Flag",  "Glyph", "Letter",  "Level", "Mask",   "Name",
                                              "OnPing", "Ratio", "Scale",  "Stamp", "Style",  "Tag",
                                              "Tint",  "Tints", "Title"};

/// Keeps the properties whose names start with "C" and reverses their order; records the
/// selection it was handed.
class TCFilterEditor : public TSelectionEditor, public ISelectionPropertyFilter {
  FK_CLASS(TCFilterEditor, TSelectionEditor)
  FK_INTERFACES(ISelectionPropertyFilter)
  void FilterProperties(const IPtr<IDesignerSelections>& ASelection, const IPtr<IInterfaceList>& Props) override {
    LastSelectionCount = ASelection->GetCount();
    std::vector<IPtr<IInterface>> Kept;
    for (int I = 0; I < Props->GetCount(); ++I)
      if (CastAs<IProperty>(Props->Get(I))->GetName()[0] == 'C') Kept.insert(Kept.begin(), Props->Get(I));
    while (Props->GetCount() > 0) Props->Delete(0);
    for (auto& P : Kept) Props->Add(P);
  }
  void Create(const IPtr<IDesigner>& ADesigner) override {
    inherited::Create(ADesigner);
    ++Made;
  }
  static inline int LastSelectionCount = 0;
  static inline int Made = 0;
};
FK_IMPLEMENT(TCFilterEditor, "GadgetUnit") {}

TEST_F(EnumerationTest, OneObjectListsItsPropertiesByNameWithEachEditorInitializedOnce) {
  TGadget* G = Make<TGadget>("Gadget1");
  // "Secret" cannot be read and "Fragile" raises only when read, so it stays.
  std::vector<String> Expected = GadgetProperties;
  Expected.insert(Expected.begin() + 7, "Fragile");
  EXPECT_EQ(NamesOf(PropertiesOf({G})), Expected);
  EXPECT_EQ(NamesOf(PropertiesOf({G}, nullptr, TTypeKinds{tkInteger, tkMethod})),
            (std::vector<String>{"Count", "Digit", "Fixed", "Fragile", "Mask", "OnPing", "Tag"}));

  RegisterPropertyEditor(TypeInfo<int>(), TGadget::StaticClass(), "Count", TCountingProperty::StaticClass());
  TGadget* H = Make<TGadget>("Gadget2");
  std::vector<IPtr<IProperty>> Props = PropertiesOf({G, H});
  EXPECT_EQ(TCountingProperty::Initialized, 2); // the trial on the first object, then the editor shown
  IPtr<IProperty> Count = Find(Props, "Count");
  ASSERT_TRUE(Count);
  EXPECT_TRUE(Count->HasInstance(G));
  EXPECT_TRUE(Count->HasInstance(H));
  EXPECT_FALSE(Count->HasInstance(Owner));
}

TEST_F(EnumerationTest, NothingIsAskedForAnEmptyOrMissingSelection) {
  Root->Selected = {Make<TGadget>("Gadget1")};
  RegisterSelectionEditor(TGadget::StaticClass(), TCFilterEditor::StaticClass());
  TCFilterEditor::Made = 0;
  int Calls = 0;
  GetComponentProperties(nullptr, tkAny, Designer(), [&](const IPtr<IProperty>&) { ++Calls; });
  GetComponentProperties(CreateSelectionList(), tkAny, Designer(), [&](const IPtr<IProperty>&) { ++Calls; });
  EXPECT_EQ(Calls, 0);
  EXPECT_EQ(TCFilterEditor::Made, 0); // no selection editor was asked for
  (void)PropertiesOf({Root->Selected[0]}, Designer());
  EXPECT_EQ(TCFilterEditor::Made, 1);
}

TEST_F(EnumerationTest, ASelectionOfTwoClassesListsWhatTheyShareWithTheSameEditor) {
  TGadget* G = Make<TGadget>("Gadget1");
  TOtherGadget* O = Make<TOtherGadget>("Other1");
  // "Tint" differs in type, "Name" has no multi-select.
  EXPECT_EQ(NamesOf(PropertiesOf({G, O})), (std::vector<String>{"Caption", "Count", "Tag"}));
  EXPECT_EQ(NamesOf(PropertiesOf({O, G})), (std::vector<String>{"Caption", "Count", "Tag"}));
  // Another editor class chosen for one of them: the property is abandoned.
  RegisterPropertyEditor(TypeInfo<String>(), TOtherGadget::StaticClass(), "Caption", TWideStringProperty::StaticClass());
  EXPECT_EQ(NamesOf(PropertiesOf({G, O})), (std::vector<String>{"Count", "Tag"}));
  EXPECT_EQ(NamesOf(PropertiesOf({O})), (std::vector<String>{"Caption", "Count", "Name", "Tag", "Tint"}));
}

TEST_F(EnumerationTest, AWriteReachesEverySelectedObjectWithOneModified) {
  TGadget* G = Make<TGadget>("Gadget1");
  TOtherGadget* O = Make<TOtherGadget>("Other1");
  G->FCount = 3;
  O->FCount = 4;
  std::vector<IPtr<IProperty>> Props = PropertiesOf({G, O}, Designer());
  IPtr<IProperty> Count = Find(Props, "Count");
  IPtr<TPropertyEditor> Editor = IPtr<TPropertyEditor>(dynamic_cast<TPropertyEditor*>(Count.Get()));
  EXPECT_FALSE(Count->AllEqual());
  EXPECT_EQ(Editor->GetVisualValue(), "");
  Log.Clear();
  Count->SetValue("17");
  EXPECT_EQ(G->FCount, 17);
  EXPECT_EQ(O->FCount, 17);
  EXPECT_EQ(Log.Count("Form1.Modified"), 1);
  EXPECT_EQ(Editor->GetVisualValue(), "17");
  // A rejected value changes nothing anywhere and tells nobody.
  ExpectRejected([&] { Count->SetValue("seventeen"); }, "'seventeen' is not a valid integer value");
  EXPECT_EQ(G->FCount, 17);
  EXPECT_EQ(O->FCount, 17);
  EXPECT_EQ(Log.Count("Form1.Modified"), 1);
}

TEST_F(EnumerationTest, ReadOnlyPropertiesShowOnlyWhenAskedExceptObjects) {
  TGadget* G = Make<TGadget>("Gadget1");
  GShowReadOnlyProps = false;
  auto Restore = Finally([]() noexcept { GShowReadOnlyProps = true; });
  std::vector<String> Names = NamesOf(PropertiesOf({G}));
  EXPECT_EQ(std::count(Names.begin(), Names.end(), "Fixed"), 0);
  EXPECT_EQ(std::count(Names.begin(), Names.end(), "Style"), 1); // its nested properties stay reachable
  GShowReadOnlyProps = true;
  IPtr<IProperty> Fixed = Find(PropertiesOf({G}), "Fixed");
  EXPECT_TRUE(Fixed->GetAttributes().Contains(paReadOnly));
  EXPECT_TRUE(Fixed->GetAttributes().Contains(paDisplayReadOnly));
}

TEST_F(EnumerationTest, AFilterAndAComponentThatRefusesReadingRuleOutProperties) {
  TGadget* G = Make<TGadget>("Gadget1");
  IPtr<IDesignerSelections> One = CreateSelectionList();
  One->Add(G);
  std::vector<String> Names;
  GetComponentProperties(
      One, tkAny, nullptr, [&](const IPtr<IProperty>& P) { Names.push_back(P->GetName()); },
      [](const IPtr<IProperty>& P) { return P->GetName().size() == 4; });
  EXPECT_EQ(Names, (std::vector<String>{"Flag", "Mask", "Name", "Tint"}));
  // A component that checks availability loses the properties whose read raises.
  TShyGadget* Shy = Make<TShyGadget>("Shy1");
  Names = NamesOf(PropertiesOf({Shy}));
  EXPECT_EQ(std::count(Names.begin(), Names.end(), "Fragile"), 0);
  EXPECT_EQ(std::count(Names.begin(), Names.end(), "Count"), 1);
}


TEST_F(EnumerationTest, SelectionFiltersAreChosenByTheDesignersSelectionAndGivenTheOneListed) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  TOtherGadget* O = Make<TOtherGadget>("Other1");
  RegisterSelectionEditor(TGadget::StaticClass(), TCFilterEditor::StaticClass());
  // The designer has selected an other gadget: the filter does not apply.
  Root->Selected = {O};
  EXPECT_EQ(NamesOf(PropertiesOf({G}, Designer())).size(), GadgetProperties.size() + 1);
  // It has selected gadgets: the filter applies to the listed objects.
  Root->Selected = {G};
  EXPECT_EQ(NamesOf(PropertiesOf({G, H}, Designer())), (std::vector<String>{"Count", "Caption"}));
  EXPECT_EQ(TCFilterEditor::LastSelectionCount, 2);
  // Without a designer no filter runs.
  EXPECT_EQ(NamesOf(PropertiesOf({G})).size(), GadgetProperties.size() + 1);
}

TEST_F(EnumerationTest, SelectionEditorsMatchTheNearestCommonAncestorInRegistrationOrder) {
  TGadget* G = Make<TGadget>("Gadget1");
  TShyGadget* Shy = Make<TShyGadget>("Shy1");
  TOtherGadget* O = Make<TOtherGadget>("Other1");
  RegisterSelectionEditor(TGadget::StaticClass(), TCFilterEditor::StaticClass());
  RegisterSelectionEditor(TComponent::StaticClass(), TSelectionEditor::StaticClass());
  IPtr<IDesignerSelections> Two = CreateSelectionList();
  Two->Add(Shy);
  Two->Add(G);
  IPtr<ISelectionEditorList> Editors = GetSelectionEditors(Designer(), Two);
  // The library's edit commands (registered for every persistent) come first.
  ASSERT_EQ(Editors->GetCount(), 3);
  EXPECT_EQ(Editors->Get(0)->GetVerb(0), "Edit");
  EXPECT_EQ(Editors->Get(0)->GetVerb(1), "Control");
  EXPECT_TRUE(QueryAs<ISelectionPropertyFilter>(Editors->Get(1)));
  EXPECT_EQ(Editors->Get(2)->GetVerbCount(), 0);
  Two->Add(O);
  EXPECT_EQ(GetSelectionEditors(Designer(), Two)->GetCount(), 2);
  EXPECT_EQ(GetSelectionEditors(Designer(), CreateSelectionList())->GetCount(), 0);
  EXPECT_EQ(GetSelectionEditors(Designer(), O)->GetCount(), 2);
  try {
    (void)Editors->Get(3);
    ADD_FAILURE();
  } catch (const EListError& E) {
    EXPECT_EQ(E.Message(), "List index out of bounds (3)");
  }
}

} // namespace
} // namespace formkit::samples
