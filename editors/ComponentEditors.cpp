//===- editors/ComponentEditors.cpp - A component's default action and verbs ===//
#include "editors/ComponentEditors.h"

#include "editors/EditorRegistry.h"

namespace formkit {

FK_IMPLEMENT(TComponentEditor, "DesignEditors") {}
FK_IMPLEMENT(TDefaultEditor, "DesignEditors") {}

void TComponentEditor::Create(TComponent* AComponent, const IPtr<IDesigner>& ADesigner) {
  inherited::Create(AComponent, ADesigner);
  FComponent = AComponent;
  FDesigner = ADesigner;
}

void TComponentEditor::Edit() {
  if (GetVerbCount() > 0) ExecuteVerb(0);
}

bool TComponentEditor::IsInInlined() { return FComponent->Owner()->ComponentState().Contains(csInline); }

void TDefaultEditor::Edit() {
  IPtr<IDesignerSelections> One = CreateSelectionList();
  One->Add(FComponent);
  FContinue = true;
  auto Clear = Finally([this]() noexcept {
    FFirst = nullptr;
    FBest = nullptr;
  });
  FFirst = FBest = nullptr;
  detail::EnumerateComponentProperties(One, tkAny, FDesigner, [this](const IPtr<IProperty>& P) { CheckEdit(P); },
                                       nullptr);
  if (!FContinue) return;
  if (FBest) FBest->Edit();
  else if (FFirst) FFirst->Edit();
}

void TDefaultEditor::CheckEdit(const IPtr<IProperty>& Prop) {
  if (FContinue) EditProperty(Prop, FContinue);
}

void TDefaultEditor::ReplaceBest(const IPtr<IProperty>& PropertyEditor) {
  FBest = PropertyEditor;
  if (FFirst == FBest) FFirst = nullptr;
}

void TDefaultEditor::EditProperty(const IPtr<IProperty>& PropertyEditor, bool&) {
  if (!FFirst && Supports<IMethodProperty>(PropertyEditor)) FFirst = PropertyEditor;
  String P = PropertyEditor->GetName();
  String B = FBest ? FBest->GetName() : String();
  // The order of preference, by name alone: OnCreate, OnChange, OnChanged, OnClick.
  if (SameText(P, "ONCREATE")) ReplaceBest(PropertyEditor);
  else if (!SameText(B, "ONCREATE")) {
    if (SameText(P, "ONCHANGE")) ReplaceBest(PropertyEditor);
    else if (!SameText(B, "ONCHANGE")) {
      if (SameText(P, "ONCHANGED")) ReplaceBest(PropertyEditor);
      else if (!SameText(B, "ONCHANGED") && SameText(P, "ONCLICK")) ReplaceBest(PropertyEditor);
    }
  }
}

IPtr<IComponentEditor> GetComponentEditor(TComponent* Component, const IPtr<IDesigner>& Designer) {
  TComponentEditorClass EditorClass = TDefaultEditor::StaticClass();
  TClass Best = TPersistent::StaticClass();
  for (const TComponentClassRec& Rec : ComponentClassList())
    if (Component->InheritsFrom(Rec.ComponentClass) && Rec.ComponentClass != Best &&
        Rec.ComponentClass->InheritsFrom(Best)) {
      EditorClass = Rec.EditorClass;
      Best = Rec.ComponentClass;
    }
  detail::RequireEditorClass(EditorClass, TBaseComponentEditor::StaticClass(), "component editor");
  return CastAs<IComponentEditor>(NewFromClass<TBaseComponentEditor>(EditorClass, Component, Designer).Get());
}

} // namespace formkit
