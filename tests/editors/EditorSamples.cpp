//===- tests/editors/EditorSamples.cpp - Classes the editor tests inspect ===//
#include "tests/editors/EditorSamples.h"

#include "core/DesignCore.h"

namespace formkit::samples {

FK_IMPLEMENT(TGadgetStyle, "GadgetUnit") {
  B.Field("Size", &TGadgetStyle::FSize).Default(10);
  B.Field("Face", &TGadgetStyle::FFace);
}

FK_IMPLEMENT(TGadget, "GadgetUnit") {
  B.Field("Count", &TGadget::FCount).Default(0);
  B.Field("Digit", &TGadget::FDigit).Type(&TypeInfo_TDigit);
  B.Field("Mask", &TGadget::FMask).Type(&TypeInfo_TCardinal);
  B.Field("Letter", &TGadget::FLetter);
  B.Field("Glyph", &TGadget::FGlyph);
  B.Field("Tint", &TGadget::FTint).Default(tiRed);
  B.Field("Level", &TGadget::FLevel);
  B.Field("Flag", &TGadget::FFlag).Default(false);
  B.Field("Tints", &TGadget::FTints).Default(TTints{tiGreen});
  B.Field("Ratio", &TGadget::FRatio);
  B.Field("Scale", &TGadget::FScale);
  B.Field("Caption", &TGadget::FCaption);
  B.Field("Title", &TGadget::FTitle);
  B.Field("Big", &TGadget::FBig);
  B.Field("Stamp", &TGadget::FStamp).Type(&TypeInfo_TDateTime);
  B.WriteOnly<int>("Secret", &TGadget::SetSecret);
  B.Property("Fragile", &TGadget::Fragile, &TGadget::SetFragile);
  B.Property("Fixed", &TGadget::Fixed);
  B.Property("Style", &TGadget::Style);
  B.Field("Buddy", &TGadget::FBuddy);
  B.Event("OnPing", &TGadget::FOnPing);
}

void TGadget::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FStyle = new TGadgetStyle;
}

void TGadget::BeforeDestruction() {
  FreeAndNil(FStyle);
  inherited::BeforeDestruction();
}

FK_IMPLEMENT(TOtherGadget, "GadgetUnit") {
  B.Field("Count", &TOtherGadget::FCount);
  B.Field("Caption", &TOtherGadget::FCaption);
  B.Field("Tint", &TOtherGadget::FTint);
}

FK_IMPLEMENT(TClicker, "GadgetUnit") {
  B.Event("OnClick", &TClicker::FOnClick);
  B.Event("OnChange", &TClicker::FOnChange);
  B.Event("Online", &TClicker::FOnline);
  B.Event("Click", &TClicker::FClick);
  B.Method<&TClicker::Pressed>("Pressed");
}
FK_IMPLEMENT(TCreator, "GadgetUnit") {
  B.Event("OnActivate", &TCreator::FOnActivate);
  B.Event("OnCreate", &TCreator::FOnCreate);
}
FK_IMPLEMENT(TDropper, "GadgetUnit") {
  B.Event("OnEnter", &TDropper::FOnEnter);
  B.Event("OnDrop", &TDropper::FOnDrop);
}
FK_IMPLEMENT(TVariantGadget, "GadgetUnit") {
  B.Field("Value", &TVariantGadget::FValue);
  B.Field("Link", &TVariantGadget::FLink);
}

FK_IMPLEMENT(TShyGadget, "GadgetUnit") {}

void TShyGadget::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetComponentStyle(ComponentStyle() + TComponentStyle{csCheckPropAvail});
}

FK_IMPLEMENT(TCountingProperty, "GadgetUnit") {}
FK_IMPLEMENT(TOtherIntegerProperty, "GadgetUnit") {}
FK_IMPLEMENT(TThirdIntegerProperty, "GadgetUnit") {}

void EditorFixture::SetUp() {
  InitializeDesignEditors();
  StartDesignCore();
  Owner = CreateComponentOf<TComponent>(nullptr);
  Root = New<fakes::TFakeRoot>("Form1", &Log);
  TCountingProperty::Initialized = 0;
}

void EditorFixture::TearDown() {
  FreeAndNil(Owner);
  Root = nullptr;
  StopDesignCore();
  CurrentGroup = -1;
}

std::vector<IPtr<IProperty>> EditorFixture::PropertiesOf(std::initializer_list<TPersistent*> Objects,
                                                         const IPtr<IDesigner>& D, TTypeKinds Kinds) {
  IPtr<IDesignerSelections> Selection = CreateSelectionList();
  for (TPersistent* Obj : Objects) Selection->Add(Obj);
  std::vector<IPtr<IProperty>> Result;
  GetComponentProperties(Selection, Kinds, D, [&](const IPtr<IProperty>& P) { Result.push_back(P); });
  return Result;
}

IPtr<IProperty> EditorFixture::EditorOf(std::initializer_list<TPersistent*> Objects, std::string_view Name,
                                        const IPtr<IDesigner>& D) {
  TPersistent* First = *Objects.begin();
  TNewPropertyEditor New =
      NewPropertyEditor(GetEditorClass(PropOf(First->ClassType(), Name), First), D, static_cast<int>(Objects.size()));
  int Index = 0;
  for (TPersistent* Obj : Objects) New.Editor->SetPropEntry(Index++, Obj, PropOf(Obj->ClassType(), Name));
  New.Editor->Initialize();
  return New.Prop;
}

std::vector<String> EditorFixture::NamesOf(const std::vector<IPtr<IProperty>>& Props) {
  std::vector<String> Names;
  for (const auto& P : Props) Names.push_back(P->GetName());
  return Names;
}

IPtr<IProperty> EditorFixture::Find(const std::vector<IPtr<IProperty>>& Props, const String& Name) {
  for (const auto& P : Props)
    if (SameText(P->GetName(), Name)) return P;
  ADD_FAILURE() << "no property " << Name;
  return nullptr;
}

} // namespace formkit::samples
