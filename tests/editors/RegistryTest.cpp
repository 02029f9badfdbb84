//===- tests/editors/RegistryTest.cpp - Choosing the editor of a property -===//
#include "tests/editors/EditorSamples.h"

#include "core/DesignCore.h"
#include "core/EditorGroups.h"

namespace formkit::samples {
namespace {

using RegistryTest = EditorFixture;

TClass EditorClassOf(TPersistent* Obj, std::string_view Prop) {
  return GetEditorClass(PropOf(Obj->ClassType(), Prop), Obj);
}

TEST_F(RegistryTest, EachKindHasItsDefaultEditorAndTheLibraryRegistersItsOwn) {
  TGadget* G = Make<TGadget>("Gadget1");
  EXPECT_EQ(EditorClassOf(G, "Count"), TIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Letter"), TCharProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Glyph"), TWideCharProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Tint"), TEnumProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Tints"), TSetProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Scale"), TFloatProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Caption"), TStringProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Title"), TWideStringProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Big"), TInt64Property::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Style"), TClassProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "OnPing"), TMethodProperty::StaticClass());
  // Registered by the library itself, in no package's group.
  EXPECT_EQ(EditorClassOf(G, "Buddy"), TComponentProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Name"), TComponentNameProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Stamp"), TDateTimeProperty::StaticClass());
  EXPECT_EQ(PropertyClassList().size(), 5u);
  for (const TPropertyClassRec& Rec : PropertyClassList()) EXPECT_EQ(Rec.Group, -1);
  for (TTypeKind K : {tkUnknown, tkArray, tkRecord, tkDynArray, tkClassRef, tkPointer, tkProcedure, tkMRecord})
    EXPECT_EQ(DefaultEditorClassOf(K), nullptr) << int(K);
  FreeEditorGroup(0);
  EXPECT_EQ(EditorClassOf(G, "Name"), TComponentNameProperty::StaticClass());
}

TEST_F(RegistryTest, ALaterRegistrationHidesAnEarlierOneUntilItsGroupIsFreed) {
  TGadget* G = Make<TGadget>("Gadget1");
  int First = NewEditorGroup();
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", TOtherIntegerProperty::StaticClass());
  int Second = NewEditorGroup();
  EXPECT_EQ(First, 0);
  EXPECT_EQ(Second, 1);
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", TThirdIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Count"), TThirdIntegerProperty::StaticClass());
  FreeEditorGroup(Second);
  EXPECT_EQ(EditorClassOf(G, "Count"), TOtherIntegerProperty::StaticClass());
  // The freed number is the lowest clear one again.
  EXPECT_EQ(NewEditorGroup(), 1);
  EXPECT_EQ(CurrentGroup, 1);
  FreeEditorGroup(First);
  EXPECT_EQ(EditorClassOf(G, "Count"), TIntegerProperty::StaticClass());
  EXPECT_EQ(NewEditorGroup(), 0);
  // A number never given out removes nothing.
  size_t Before = PropertyClassList().size();
  FreeEditorGroup(57);
  FreeEditorGroup(-5);
  EXPECT_EQ(PropertyClassList().size(), Before);
  EXPECT_EQ(NewEditorGroup(), 2);
}

TEST_F(RegistryTest, ANameWithoutAClassServesEveryPropertyOfTheType) {
  TGadget* G = Make<TGadget>("Gadget1");
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "Nothing", TOtherIntegerProperty::StaticClass());
  EXPECT_TRUE(PropertyClassList().front().PropertyName.empty());
  EXPECT_EQ(EditorClassOf(G, "Count"), TOtherIntegerProperty::StaticClass());
  // With a class the name is kept and compared without regard to case.
  RegisterPropertyEditor(TypeInfo<int>(), TGadget::StaticClass(), "COUNT", TThirdIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Count"), TThirdIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Secret"), TOtherIntegerProperty::StaticClass());
}

TEST_F(RegistryTest, OfTwoRecordsThatBeatEachOtherTheOneMetLastWins) {
  // An exact type without a class beats a base type with a class (its type is exact),
  // and the reverse holds too (the other has a class): the record met last, the older, wins.
  TGadget* G = Make<TGadget>("Gadget1");
  PTypeInfo Base = TPersistent::StaticClass()->TypeInfo();
  PTypeInfo Exact = TGadgetStyle::StaticClass()->TypeInfo();
  int Group = NewEditorGroup();
  RegisterPropertyEditor(Exact, nullptr, "", TOtherIntegerProperty::StaticClass());
  RegisterPropertyEditor(Base, TGadget::StaticClass(), "", TThirdIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Style"), TOtherIntegerProperty::StaticClass());
  FreeEditorGroup(Group);
  RegisterPropertyEditor(Base, TGadget::StaticClass(), "", TThirdIntegerProperty::StaticClass());
  RegisterPropertyEditor(Exact, nullptr, "", TOtherIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Style"), TThirdIntegerProperty::StaticClass());
}

TEST_F(RegistryTest, MoreSpecificClassesAndTypesWin) {
  TGadget* G = Make<TGadget>("Gadget1");
  TShyGadget* Shy = Make<TShyGadget>("Shy1");
  RegisterPropertyEditor(TypeInfo<int>(), TGadget::StaticClass(), "", TOtherIntegerProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<int>(), TShyGadget::StaticClass(), "", TThirdIntegerProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<int>(), TComponent::StaticClass(), "", TCountingProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Count"), TOtherIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(Shy, "Count"), TThirdIntegerProperty::StaticClass());
  // A class type registered for a base class serves its descendants; the nearer one wins.
  RegisterPropertyEditor(TComponent::StaticClass()->TypeInfo(), nullptr, "", TOtherIntegerProperty::StaticClass());
  RegisterPropertyEditor(TGadget::StaticClass()->TypeInfo(), nullptr, "", TThirdIntegerProperty::StaticClass());
  RegisterPropertyEditor(TPersistent::StaticClass()->TypeInfo(), nullptr, "", TCountingProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Buddy"), TThirdIntegerProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(G, "Style"), TCountingProperty::StaticClass());
}

TEST_F(RegistryTest, AMapperBeatsEveryRegistrationUnlessItHasNoOpinion) {
  TGadget* G = Make<TGadget>("Gadget1");
  UnlistPublishedProperty(TGadget::StaticClass(), "Count");
  EXPECT_EQ(EditorClassOf(G, "Count"), nullptr);
  int Asked = 0;
  RegisterPropertyMapper([&](TPersistent*, PPropInfo) -> TClass {
    ++Asked;
    return nullptr;
  });
  EXPECT_EQ(EditorClassOf(G, "Count"), nullptr);
  RegisterPropertyMapper([](TPersistent*, PPropInfo P) -> TClass {
    return P->Name == "Count" ? TOtherIntegerProperty::StaticClass() : nullptr;
  });
  EXPECT_EQ(EditorClassOf(G, "Count"), TOtherIntegerProperty::StaticClass());
  EXPECT_EQ(Asked, 1); // the newest mapper answered first, so the older one was not asked
  EXPECT_EQ(EditorClassOf(G, "Digit"), TIntegerProperty::StaticClass());
  EXPECT_EQ(Asked, 2);
}

TEST_F(RegistryTest, UnlistingHidesAPropertyOfAClassAndItsDescendantsOnly) {
  TGadget* G = Make<TGadget>("Gadget1");
  TShyGadget* Shy = Make<TShyGadget>("Shy1");
  TOtherGadget* O = Make<TOtherGadget>("Other1");
  UnlistPublishedProperty(TGadget::StaticClass(), "caption");
  UnlistPublishedProperty(TGadget::StaticClass(), "NoSuchProperty");
  EXPECT_EQ(PropertyClassList().size(), 6u);
  EXPECT_EQ(EditorClassOf(G, "Caption"), nullptr);
  EXPECT_EQ(EditorClassOf(Shy, "Caption"), nullptr);
  EXPECT_EQ(EditorClassOf(O, "Caption"), TStringProperty::StaticClass());
  std::vector<String> Names = NamesOf(PropertiesOf({G}));
  EXPECT_EQ(std::count(Names.begin(), Names.end(), "Caption"), 0);
  // A more specific registration shows it again.
  RegisterPropertyEditor(TypeInfo<String>(), TShyGadget::StaticClass(), "Caption", TStringProperty::StaticClass());
  EXPECT_EQ(EditorClassOf(Shy, "Caption"), TStringProperty::StaticClass());
}

TEST_F(RegistryTest, AClassGroupLimitsARegistrationToObjectsOfThatGroup) {
  TGadget* G = Make<TGadget>("Gadget1");
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", TOtherIntegerProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", TThirdIntegerProperty::StaticClass());
  SetPropertyEditorGroup(TOtherIntegerProperty::StaticClass(), TGadget::StaticClass());
  EXPECT_EQ(PropertyClassList()[1].ClassGroup, ClassGroupOf(TGadget::StaticClass()));
  EXPECT_EQ(PropertyClassList()[0].ClassGroup, nullptr);
  SetPropertyEditorGroup(TCountingProperty::StaticClass(), TGadget::StaticClass()); // none: nothing
  EXPECT_EQ(EditorClassOf(G, "Count"), TThirdIntegerProperty::StaticClass());
}

std::vector<int>* GroupCalls = nullptr;
void HeardA(int G) { GroupCalls->push_back(100 + G); }
void HeardB(int G) { GroupCalls->push_back(200 + G); }

TEST_F(RegistryTest, GroupSubscribersHearTheGroupLastSubscribedFirst) {
  std::vector<int> Calls;
  GroupCalls = &Calls;
  NotifyGroupChange(&HeardA);
  NotifyGroupChange(&HeardB);
  NotifyGroupChange(&HeardA); // moves to the end
  int Group = NewEditorGroup();
  FreeEditorGroup(Group);
  EXPECT_EQ(Calls, (std::vector<int>{100 + Group, 200 + Group}));
  UnnotifyGroupChange(&HeardA);
  UnnotifyGroupChange(&HeardB);
  UnnotifyGroupChange(&HeardB);
  FreeEditorGroup(Group);
  EXPECT_EQ(Calls.size(), 2u);
  GroupCalls = nullptr;
}

TEST_F(RegistryTest, FreeingAGroupDropsItsComponentAndSelectionEditorsAndMappers) {
  int Group = NewEditorGroup();
  RegisterComponentEditor(TGadget::StaticClass(), TOtherIntegerProperty::StaticClass());
  RegisterSelectionEditor(TGadget::StaticClass(), TSelectionEditor::StaticClass());
  RegisterPropertyMapper([](TPersistent*, PPropInfo) -> TClass { return nullptr; });
  CurrentGroup = -1;
  RegisterSelectionEditor(TComponent::StaticClass(), TSelectionEditor::StaticClass());
  ASSERT_EQ(ComponentClassList().size(), 1u);
  EXPECT_EQ(ComponentClassList()[0].Group, Group);
  // The library's own edit commands come first, for every selection.
  ASSERT_EQ(SelectionEditorDefinitions().size(), 3u);
  EXPECT_EQ(SelectionEditorDefinitions()[0]->Editor(), TEditActionSelectionEditor::StaticClass());
  EXPECT_TRUE(SelectionEditorDefinitions()[1]->Matches(TShyGadget::StaticClass()));
  EXPECT_FALSE(SelectionEditorDefinitions()[1]->Matches(TOtherGadget::StaticClass()));
  FreeEditorGroup(Group);
  EXPECT_TRUE(ComponentClassList().empty());
  EXPECT_TRUE(PropertyMapperList().empty());
  ASSERT_EQ(SelectionEditorDefinitions().size(), 2u);
  EXPECT_EQ(SelectionEditorDefinitions()[1]->Group(), -1);
}

TEST_F(RegistryTest, AClassRegisteredAsAnEditorOfAnotherKindIsRefusedWhenMade) {
  TGadget* G = Make<TGadget>("Gadget1");
  auto Refusal = [](auto&& Make) {
    try {
      Make();
    } catch (const EInvalidCast& E) {
      return E.Message();
    }
    return String("made");
  };
  RegisterPropertyEditor(TypeInfo<int>(), TGadget::StaticClass(), "Count", TGadget::StaticClass());
  EXPECT_EQ(Refusal([&] { (void)PropertiesOf({G}); }), "Class TGadget is not a property editor class");
  RegisterComponentEditor(TGadget::StaticClass(), TIntegerProperty::StaticClass());
  EXPECT_EQ(Refusal([&] { (void)GetComponentEditor(G, nullptr); }),
            "Class TIntegerProperty is not a component editor class");
  RegisterComponentEditor(TGadget::StaticClass(), nullptr);
  EXPECT_EQ(Refusal([&] { (void)GetComponentEditor(G, nullptr); }), "Class (none) is not a component editor class");
  RegisterSelectionEditor(TGadget::StaticClass(), TGadget::StaticClass());
  EXPECT_EQ(Refusal([&] { (void)GetSelectionEditors(nullptr, G); }),
            "Class TGadget is not a selection editor class");
}

TEST_F(RegistryTest, WithTheRegistriesStoppedRegistrationsDoNothing) {
  StopDesignCore();
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", TOtherIntegerProperty::StaticClass());
  EXPECT_TRUE(PropertyClassList().empty());
  StartDesignCore();
  EXPECT_EQ(PropertyClassList().size(), 5u);
}

TEST_F(RegistryTest, APropertyListComparesTypeAndNameWithoutRegardToCase) {
  TGadget* G = Make<TGadget>("Gadget1");
  TOtherGadget* O = Make<TOtherGadget>("Other1");
  TPropInfoList Gadget(G, tkAny);
  TPropInfoList Other(O, tkAny);
  EXPECT_EQ(Gadget.Items(0)->Name, "Big"); // sorted by name
  EXPECT_TRUE(Gadget.Contains(PropOf(TOtherGadget::StaticClass(), "Count")));
  EXPECT_FALSE(Gadget.Contains(PropOf(TOtherGadget::StaticClass(), "Tint"))); // an int there
  Other.Intersect(Gadget);
  std::vector<String> Kept;
  for (int I = 0; I < Other.Count(); ++I) Kept.push_back(Other.Items(I)->Name);
  EXPECT_EQ(Kept, (std::vector<String>{"Caption", "Count", "Name", "Tag"}));
  TPropInfoList Ordinals(G, TTypeKinds{tkEnumeration});
  EXPECT_EQ(Ordinals.Count(), 3); // Flag, Level, Tint
}

} // namespace
} // namespace formkit::samples
