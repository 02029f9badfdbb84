//===- tests/editors/PropertyEditorTest.cpp - What every editor does ------===//
#include "tests/editors/EditorSamples.h"

namespace formkit::samples {
namespace {

using PropertyEditorTest = EditorFixture;

TEST_F(PropertyEditorTest, TheSafeReadNamesWhyAValueCannotBeShown) {
  TGadget* G = Make<TGadget>("Gadget1");
  String Value = "stale";
  // A write-only property: no exception, the text of "not available".
  TNewPropertyEditor Secret = NewPropertyEditor(TIntegerProperty::StaticClass(), nullptr, 1);
  Secret.Editor->SetPropEntry(0, G, PropOf(TGadget::StaticClass(), "Secret"));
  Secret.Editor->Initialize();
  EXPECT_FALSE(Secret.Prop->GetEditValue(Value));
  EXPECT_EQ(Value, "(Not available)");
  // A getter that raises: its message in parentheses.
  IPtr<IProperty> Fragile = EditorOf({G}, "Fragile");
  EXPECT_FALSE(Fragile->GetEditValue(Value));
  EXPECT_EQ(Value, "(The gadget is unplugged)");
  EXPECT_THROW(Fragile->GetValue(), EInvalidOperation);
  WideString Wide;
  EXPECT_FALSE(dynamic_cast<TPropertyEditor*>(Fragile.Get())->GetEditValueW(Wide));
  EXPECT_EQ(Wide, u"(The gadget is unplugged)");
  // A read-only property: its text, but not editable; Edit does nothing.
  IPtr<IProperty> Fixed = EditorOf({G}, "Fixed");
  EXPECT_FALSE(Fixed->GetEditValue(Value));
  EXPECT_EQ(Value, "42");
  EXPECT_FALSE(Fixed->AutoFill());
  Fixed->Edit();
  EXPECT_TRUE(EditorOf({G}, "Count")->GetEditValue(Value));
  EXPECT_EQ(Value, "0");
}

TEST_F(PropertyEditorTest, TheBaseEditorShowsUnknownIgnoresWritesAndAgreesOnlyWithItself) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", TPropertyEditor::StaticClass());
  IPtr<IProperty> One = EditorOf({G}, "Count");
  EXPECT_EQ(One->GetValue(), "(Unknown)");
  EXPECT_TRUE(One->AllEqual());
  One->SetValue("5");
  EXPECT_EQ(G->FCount, 0);
  EXPECT_EQ(One->GetAttributes(), (TPropertyAttributes{paMultiSelect, paRevertable}));
  EXPECT_EQ(One->GetEditLimit(), 2047);
  EXPECT_EQ(One->GetPropType(), TypeInfo<int>());
  EXPECT_EQ(QueryAs<IPropertyKind>(One)->GetKind(), tkInteger);
  One->Revert(); // no designer: nothing
  IPtr<IProperty> Two = EditorOf({G, H}, "Count");
  EXPECT_FALSE(Two->AllEqual());
  EXPECT_EQ(dynamic_cast<TPropertyEditor*>(Two.Get())->GetVisualValue(), "");
}

TEST_F(PropertyEditorTest, ASetterThatRaisesLeavesEarlierPairsWrittenAndTellsNobody) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  H->FBrittle = true;
  IPtr<IProperty> Both = EditorOf({G, H}, "Fragile", Designer());
  Log.Clear();
  try {
    Both->SetValue("9");
    ADD_FAILURE();
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "The gadget broke");
  }
  EXPECT_EQ(G->FFragileWrites, 1);
  EXPECT_EQ(Log.Count("Form1.Modified"), 0);
  H->FBrittle = false;
  Both->SetValue("9");
  EXPECT_EQ(H->FFragileWrites, 1);
  EXPECT_EQ(Log.Count("Form1.Modified"), 1);
}

TEST_F(PropertyEditorTest, AValueIsDefaultWhenTheStreamWouldNotTakeIt) {
  TGadget* G = Make<TGadget>("Gadget1");
  TGadget* H = Make<TGadget>("Gadget2");
  auto IsDefault = [&](std::initializer_list<TPersistent*> Objects, std::string_view Name) {
    return QueryAs<IProperty70>(EditorOf(Objects, Name, Designer()))->GetIsDefault();
  };
  // Without a designer everything counts as default.
  EXPECT_TRUE(QueryAs<IProperty70>(EditorOf({G}, "Count"))->GetIsDefault());
  EXPECT_TRUE(IsDefault({G}, "Count"));
  G->FCount = 3;
  EXPECT_FALSE(IsDefault({G}, "Count"));
  EXPECT_FALSE(IsDefault({G, H}, "Count")); // they differ
  EXPECT_TRUE(IsDefault({G}, "Name")); // never stored
  // An object whose own properties are all default counts as default.
  EXPECT_TRUE(IsDefault({G}, "Style"));
  G->FStyle->FSize = 11;
  EXPECT_FALSE(IsDefault({G}, "Style"));
  // A set element compares its bit with the declared default.
  G->FTints = TTints{tiGreen, tiBlue};
  std::vector<IPtr<IProperty>> Elements;
  EditorOf({G}, "Tints", Designer())->GetProperties([&](const IPtr<IProperty>& P) { Elements.push_back(P); });
  ASSERT_EQ(Elements.size(), 3u);
  EXPECT_TRUE(QueryAs<IProperty70>(Elements[0])->GetIsDefault());
  EXPECT_TRUE(QueryAs<IProperty70>(Elements[1])->GetIsDefault());
  EXPECT_FALSE(QueryAs<IProperty70>(Elements[2])->GetIsDefault());
}

} // namespace
} // namespace formkit::samples
