//===- editors/PropertyDefault.cpp - Whether a value would be written ----===//
//
// `GetIsDefault` compares the value of the first pair with what the module's stream
// would take as given: the class's default, or the value of the instance's
// counterpart in the ancestor module. The counterpart is found by walking the
// module the way the writer does, keeping the ancestor's children beside each level.
//
//===----------------------------------------------------------------------===//
#include "editors/PropertyEditor.h"

#include "platform/Filer.h"

namespace formkit {

namespace {

/// `Name` beneath `Component`: its own owned components first, then each owned
/// component's, in order; the first hit.
TComponent* FindNestedComponent(TComponent* Component, const String& Name) {
  if (!Component) return nullptr;
  if (TComponent* Found = Component->FindComponent(Name)) return Found;
  for (int I = 0; I < Component->ComponentCount(); ++I)
    if (TComponent* Found = FindNestedComponent(Component->Components(I), Name)) return Found;
  return nullptr;
}

/// The object that property `Prop` holds on `Ancestor`, when the ancestor has the property.
TPersistent* AncestorValueOf(TPersistent* Ancestor, PPropInfo Prop) {
  if (!Ancestor || !Ancestor->InheritsFrom(Prop->Declaring)) return nullptr;
  return dynamic_cast<TPersistent*>(GetObjectProp(Ancestor, Prop));
}

} // namespace

bool TPropertyEditor::GetIsDefault() {
  if (!FDesigner || FPropCount <= 0) return true;
  if (!AllEqual()) return false;
  TPersistent* Instance = FPropList[0].Instance;
  PPropInfo Prop = FPropList[0].PropInfo;
  if (!IsStoredProp(Instance, Prop)) return true;

  // The working state lives for this call only.
  auto ClearWorkingState = Finally([this]() noexcept {
    FRoot = FRootAncestor = FLookingFor = nullptr;
    FAncestor = nullptr;
  });
  FRoot = FDesigner->GetRoot();
  IPtr<IDesigner> AncestorDesigner = FDesigner->GetAncestorDesigner();
  FRootAncestor = AncestorDesigner ? AncestorDesigner->GetRoot() : nullptr;
  FAncestor = FRootAncestor;
  auto* Component = dynamic_cast<TComponent*>(Instance);
  if (Component) FLookingFor = Component;
  if (Component && FAncestor && Component->ComponentState().Contains(csAncestor)) FindAncestorOf(Component);
  else FAncestor = FRootAncestor = nullptr;
  return IsDefaultAgainstAncestor(Instance, Prop);
}

void TPropertyEditor::FindAncestorOf(TComponent* Instance) {
  FDoneLooking = false;
  if (!Instance->ComponentStyle().Contains(csSubComponent)) {
    WriteComponentSimulation(FRoot);
    return;
  }
  // A subcomponent is not streamed as a child: find its first owner that is, then look
  // the subcomponent up by name beneath that owner's counterpart.
  String Name = Instance->Name();
  while (FLookingFor->Owner() && FLookingFor->ComponentStyle().Contains(csSubComponent))
    FLookingFor = FLookingFor->Owner();
  WriteComponentSimulation(FRoot);
  FAncestor = FindNestedComponent(dynamic_cast<TComponent*>(FAncestor), Name);
}

bool TPropertyEditor::IsDefaultAgainstAncestor(TPersistent* Instance, PPropInfo Prop) {
  auto Lookup = [this](TPersistent*& A, TComponent*& R, TComponent*& L, TComponent*& RA) {
    GetLookupInfo(A, R, L, RA);
  };
  if (IsDefaultPropertyValue(Instance, Prop, Lookup)) return true;
  if (Prop->Kind() != tkClass) return false;
  auto* Value = dynamic_cast<TPersistent*>(GetObjectProp(Instance, Prop));
  // Nothing held while the stream would want something: not default.
  if (!Value) return false;

  bool Result = true;
  {
    TPersistent* SavedAncestor = FAncestor;
    auto RestoreAncestor = Finally([&]() noexcept { FAncestor = SavedAncestor; });
    if (AncestorIsValid(FAncestor, FRoot, FRootAncestor)) FAncestor = AncestorValueOf(FAncestor, Prop);
    for (PPropInfo Sub : Value->ClassType()->Properties())
      if (!IsDefaultPropertyValue(Value, Sub, Lookup)) {
        Result = false;
        break;
      }
  }
  if (auto* Collection = dynamic_cast<TCollection*>(Value)) {
    bool Comparable = AncestorIsValid(FAncestor, FRoot, FRootAncestor);
    auto* AncestorCollection = Comparable ? dynamic_cast<TCollection*>(AncestorValueOf(FAncestor, Prop)) : nullptr;
    if (!AncestorCollection || !CollectionsEqual(Collection, AncestorCollection, FRoot, FRootAncestor))
      Result = false;
  }
  return Result;
}

void TPropertyEditor::GetLookupInfo(TPersistent*& Ancestor, TComponent*& Root, TComponent*& LookupRoot,
                                    TComponent*& RootAncestor) {
  Ancestor = FAncestor;
  Root = FRoot;
  LookupRoot = FRoot;
  RootAncestor = FRootAncestor;
}

void TPropertyEditor::WriteComponentSimulation(TComponent* Component) {
  if (FDoneLooking) return;
  TPersistent* SavedAncestor = FAncestor;
  TComponent* SavedRootAncestor = FRootAncestor;
  if (FAncestorList) {
    FAncestor = nullptr;
    for (TComponent* Candidate : *FAncestorList)
      if (SameText(Candidate->Name(), Component->Name())) {
        FAncestor = Candidate;
        break;
      }
  }
  if (Component == FLookingFor || SameText(Component->Name(), FLookingFor->Name())) {
    FDoneLooking = true; // a hit: the fields stay on the counterpart
    return;
  }
  // A nested frame: its ancestor is the root of the module its class was designed in.
  if (!FAncestor && Component != FDesigner->GetRoot() && Component->ClassType()->Generated) {
    if (TComponent* Found = FDesigner->FindRootAncestor(Component->ClassName())) FAncestor = FRootAncestor = Found;
  }

  std::vector<TComponent*>* SavedList = FAncestorList;
  TComponent* SavedRoot = FRoot;
  std::vector<TComponent*> AncestorChildren;
  auto RestoreList = Finally([&]() noexcept { FAncestorList = SavedList; });
  FAncestorList = nullptr;
  if (auto* AncestorComponent = dynamic_cast<TComponent*>(FAncestor)) {
    if (AncestorComponent->ComponentState().Contains(csInline)) FRootAncestor = AncestorComponent;
    FAncestorList = &AncestorChildren;
    AncestorComponent->GetChildren([&](TComponent* Child) { AncestorChildren.push_back(Child); }, FRootAncestor);
  }
  if (Component->ComponentState().Contains(csInline)) FRoot = Component;
  Component->GetChildren([this](TComponent* Child) { WriteComponentSimulation(Child); }, FRoot);
  if (FDoneLooking) return;
  // No hit beneath this component: the walk goes on from where it entered.
  FRoot = SavedRoot;
  FAncestor = SavedAncestor;
  FRootAncestor = SavedRootAncestor;
}

} // namespace formkit
