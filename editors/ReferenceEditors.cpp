//===- editors/ReferenceEditors.cpp - Editors of references, events, variants ===//
#include "editors/ReferenceEditors.h"

#include "editors/EditorRegistry.h"
#include "platform/FormatSettings.h"

namespace formkit {

FK_IMPLEMENT(TComponentProperty, "DesignEditors") {}
FK_IMPLEMENT(TInterfaceProperty, "DesignEditors") {}
FK_IMPLEMENT(TMethodProperty, "DesignEditors") {}
FK_IMPLEMENT(TVariantProperty, "DesignEditors") {}
FK_IMPLEMENT(TVariantTypeProperty, "DesignEditors") {}
FK_IMPLEMENT(TCollectionProperty, "DesignEditors") {}

TShowCollectionEditorProc ShowCollectionEditorProc;
TClass DefaultCollectionEditorClass = nullptr;

namespace {
[[noreturn]] void RaiseInvalidValue() { throw EDesignPropertyError(SInvalidPropertyValue); }

/// Whether `Obj`'s class is, or descends from, a class named `Name`: the framework's
/// classes lie above this library.
bool IsOfClassNamed(const TObject* Obj, std::string_view Name) {
  for (TClass C = Obj->ClassType(); C; C = C->Parent)
    if (C->ClassNameIs(Name)) return true;
  return false;
}

/// The component a class-valued property of `Obj` holds, or null.
TComponent* HeldComponent(TPersistent* Obj, PPropInfo Prop) {
  return dynamic_cast<TComponent*>(GetObjectProp(Obj, Prop));
}
} // namespace

//===----------------------------------------------------------------------===//
// TComponentProperty
//===----------------------------------------------------------------------===//

TComponent* TComponentProperty::GetComponentReference() { return HeldComponent(FPropList[0].Instance, GetPropInfo()); }

bool TComponentProperty::IsOnDesignSurface(TComponent* Component) {
  return Component && static_cast<bool>(QueryAs<IDesigner>(FindRootDesigner(Component)));
}

bool TComponentProperty::ShowReferenceProperty() {
  TComponent* C = GetComponentReference();
  if (!C || C->ComponentStyle().Contains(csSubComponent)) return true;
  if (!C->Owner()) return false;
  return !C->Owner()->Owner() || IsOfClassNamed(C->Owner(), "TDataModule");
}

IPtr<IDesignerSelections> TComponentProperty::GetSelections() {
  if (!GetComponentReference() || !AllEqual()) return nullptr;
  IPtr<IDesignerSelections> Result = CreateSelectionList();
  for (int I = 0; I < FPropCount; ++I) Result->Add(HeldComponent(FPropList[I].Instance, FPropList[I].PropInfo));
  return Result;
}

bool TComponentProperty::AllEqual() {
  TComponent* First = GetComponentReference();
  for (int I = 1; I < FPropCount; ++I)
    if (HeldComponent(FPropList[I].Instance, FPropList[I].PropInfo) != First) return false;
  return IsOnDesignSurface(First);
}

void TComponentProperty::Edit() {
  TComponent* C = GetComponentReference();
  if (FDesigner && C && TShiftState{ssCtrl, ssLeft} <= FDesigner->GetShiftState()) {
    FDesigner->SelectComponent(C);
    return;
  }
  inherited::Edit();
}

TPropertyAttributes TComponentProperty::GetAttributes() {
  TPropertyAttributes Result = GetPropInfo()->IsWritable() ? TPropertyAttributes{paValueList, paSortList, paRevertable}
                                                           : TPropertyAttributes{paReadOnly};
  if (GReferenceExpandable && GetComponentReference() && AllEqual())
    return Result + TPropertyAttributes{paSubProperties, paMultiSelect, paVolatileSubProperties};
  return Result + TPropertyAttributes{paMultiSelect};
}

void TComponentProperty::GetProperties(const TGetPropProc& Proc) {
  IPtr<IDesignerSelections> Selections = GetSelections();
  if (!Selections) return;
  // The referenced component shows through its own module's designer, events included.
  IPtr<IDesigner> Designer = QueryAs<IDesigner>(FindRootDesigner(Selections->Get(0)));
  if (!Designer) Designer = FDesigner;
  detail::EnumerateComponentProperties(Selections, tkAny, Designer, Proc, &TComponentProperty::FilterFunc);
}

String TComponentProperty::GetValue() {
  TComponent* C = GetComponentReference();
  if (!FDesigner) return C ? C->Name() : String();
  return FDesigner->GetComponentName(C);
}

void TComponentProperty::GetValues(const TGetStrProc& Proc) {
  if (FDesigner) FDesigner->GetComponentNames(GetTypeData(GetPropType()), Proc);
}

void TComponentProperty::SetValue(const String& Value) {
  TComponent* C = nullptr;
  if (!Value.empty()) {
    C = FDesigner ? FDesigner->GetComponent(Value) : nullptr;
    TClass Wanted = GetTypeData(GetPropType())->ClassRef;
    if (!C || !Wanted || !C->InheritsFrom(Wanted)) RaiseInvalidValue();
  }
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) { SetObjectProp(Obj, P, C); });
}

bool TComponentProperty::FilterFunc(const IPtr<IProperty>& ATestEditor) {
  return !ATestEditor->GetAttributes().Contains(paNotNestable);
}

//===----------------------------------------------------------------------===//
// TInterfaceProperty
//===----------------------------------------------------------------------===//

TComponent* TInterfaceProperty::GetComponent(const IPtr<IInterface>& AInterface) {
  IPtr<IComponentReferenceSource> Source = QueryAs<IComponentReferenceSource>(AInterface);
  return Source ? Source->GetComponent() : nullptr;
}

TComponent* TInterfaceProperty::GetComponentReference() { return GetComponent(GetIntfValue()); }

IPtr<IDesignerSelections> TInterfaceProperty::GetSelections() {
  if (!GetIntfValue() || !AllEqual()) return nullptr;
  IPtr<IDesignerSelections> Result = CreateSelectionList();
  for (int I = 0; I < FPropCount; ++I) Result->Add(GetComponent(GetIntfValueAt(I)));
  return Result;
}

bool TInterfaceProperty::AllEqual() {
  IPtr<IInterface> First = GetIntfValue();
  for (int I = 1; I < FPropCount; ++I)
    if (!SameObject(GetIntfValueAt(I).Get(), First.Get())) return false;
  return IsOnDesignSurface(GetComponent(First));
}

bool TInterfaceProperty::Answers(TComponent* Component) {
  if (!Component) return false;
  // Components are handed out as interfaces only through their reference, so the
  // reference is what must answer to the property's interface.
  IPtr<IComponentReferenceSource> Reference = ComponentReference(Component);
  void* Out = nullptr;
  if (!Reference->QueryInterface(GetTypeData(GetPropType())->Guid, &Out)) return false;
  IPtr<IInterface>::Adopt(static_cast<IInterface*>(Out)); // releases the query's count
  return true;
}

void TInterfaceProperty::GetValues(const TGetStrProc& Proc) {
  if (!FDesigner) return;
  FGetValuesStrProc = Proc;
  auto Clear = Finally([this]() noexcept { FGetValuesStrProc = nullptr; });
  FDesigner->GetComponentNames(GetTypeData(TComponent::StaticClass()->TypeInfo()),
                               [this](const String& S) { ReceiveComponentNames(S); });
}

void TInterfaceProperty::ReceiveComponentNames(const String& S) {
  TComponent* C = FDesigner->GetComponent(S);
  if (FGetValuesStrProc && C && Answers(C)) FGetValuesStrProc(S);
}

void TInterfaceProperty::SetValue(const String& Value) {
  IPtr<IInterface> Reference;
  if (!Value.empty()) {
    TComponent* C = FDesigner ? FDesigner->GetComponent(Value) : nullptr;
    if (!Answers(C)) RaiseInvalidValue();
    Reference = ComponentReference(C);
  }
  SetIntfValue(Reference);
}

//===----------------------------------------------------------------------===//
// TMethodProperty
//===----------------------------------------------------------------------===//

bool TMethodProperty::AllNamed() {
  for (int I = 0; I < FPropCount; ++I)
    if (FPropList[I].Instance->GetNamePath().empty()) return false;
  return true;
}

void TMethodProperty::RequireAllNamed() {
  if (!AllNamed()) throw EDesignPropertyError(SCannotCreateName);
}

String TMethodProperty::GetTrimmedEventName() {
  String Name = GetName();
  if (Name.size() >= 2 && (Name[0] == 'O' || Name[0] == 'o') && (Name[1] == 'N' || Name[1] == 'n'))
    return Name.substr(2);
  return Name;
}

String TMethodProperty::GetFormMethodName() {
  TPersistent* Instance = FPropList[0].Instance;
  String Result;
  if (FDesigner && Instance == FDesigner->GetRoot()) {
    Result = FDesigner->GetRootClassName();
    if (!Result.empty() && Result[0] == 'T') Result.erase(0, 1);
  } else if (FDesigner) {
    for (char Ch : FDesigner->GetObjectName(Instance))
      if (String("-.>[]").find(Ch) == String::npos) Result += Ch;
  }
  if (Result.empty()) throw EDesignPropertyError(SCannotCreateName);
  return Result + GetTrimmedEventName();
}

bool TMethodProperty::AllEqual() {
  if (FPropCount <= 1) return true;
  TMethod First = GetMethodValue();
  for (int I = 1; I < FPropCount; ++I)
    if (!(GetMethodValueAt(I) == First)) return false;
  return true;
}

TPropertyAttributes TMethodProperty::GetAttributes() {
  return TPropertyAttributes{paValueList, paMultiSelect, paSortList, paRevertable};
}

String TMethodProperty::GetValue() { return FDesigner ? FDesigner->GetMethodName(GetMethodValue()) : String(); }

void TMethodProperty::GetValues(const TGetStrProc& Proc) {
  if (FDesigner) FDesigner->GetMethods(GetTypeData(GetPropType()), Proc);
}

void TMethodProperty::Edit() {
  IPtr<IDesigner> Designer = FDesigner; // the editor may go while the host shows the source
  if (!Designer) return;                // no module: no source to bind to
  RequireAllNamed();
  String Name = GetValue();
  if (!Name.empty() && !Designer->MethodFromAncestor(GetMethodValue())) {
    Designer->ShowMethod(Name);
    return;
  }
  if (Name.empty()) Name = GetFormMethodName();
  if (Name.empty()) throw EDesignPropertyError(SCannotCreateName);
  SetValue(Name);
  Designer->ShowMethod(Name);
}

void TMethodProperty::SetValue(const String& Value) {
  IPtr<IDesigner> Designer = FDesigner;
  if (!Designer) return; // no module: no source to bind to
  RequireAllNamed();
  String Current = GetValue();
  if (!Current.empty() && !Value.empty() && (SameText(Current, Value) || !Designer->MethodExists(Value)) &&
      !Designer->MethodFromAncestor(GetMethodValue())) {
    Designer->RenameMethod(Current, Value); // every event bound to it follows
    return;
  }
  bool New = !Value.empty() && !Designer->MethodExists(Value);
  TMethod Old = GetMethodValue();
  SetMethodValue(Designer->CreateMethod(Value, GetTypeData(GetPropType())));
  if (!New) return;
  if (FPropCount == 1 && Old.Code && Old.Data) CheckChainCall(Value, Old);
  Designer->ShowMethod(Value);
}

void TMethodProperty::CheckChainCall(const String& MethodName, const TMethod& Method) {
  auto* Instance = dynamic_cast<TComponent*>(FPropList[0].Instance);
  if (!Instance || Instance->Name().empty()) return;
  auto* Data = static_cast<TObject*>(Method.Data);
  if (Data == FDesigner->GetRoot()) return;
  auto* Holder = dynamic_cast<TComponent*>(Data);
  if (!Holder) return;
  String InstanceMethod = Holder->MethodName(Method.Code);
  if (!InstanceMethod.empty())
    FDesigner->ChainCall(MethodName, Holder->Name(), InstanceMethod, GetTypeData(GetPropType()));
}

//===----------------------------------------------------------------------===//
// Variants
//===----------------------------------------------------------------------===//

const char* VariantTypeName(int Code) noexcept {
  static constexpr const char* Names[21] = {"Unassigned", "Null",    "Smallint", "Integer", "Single", "Double",
                                            "Currency",   "Date",    "OleStr",   nullptr,   nullptr,  "Boolean",
                                            nullptr,      nullptr,   nullptr,    nullptr,   "Shortint", "Byte",
                                            "Word",       "LongWord", "Int64"};
  return Code >= 0 && Code < 21 ? Names[Code] : nullptr;
}

namespace {
constexpr int VarTypeMask = 4095;

/// `Text` cast to type `To` when it reads back the same through it; else nothing.
bool TryKeepType(const String& Text, std::uint16_t To, TVariant& Result) {
  if (To == 6) return false; // currency: this library's variants hold none
  try {
    TVariant Cast = VarAsType(TVariant(Text), To);
    if (To != varDate && Cast.AsString() != Text) return false;
    Result = Cast;
    return true;
  } catch (const Exception&) {
    return false;
  }
}
} // namespace

String TVariantProperty::GetValue() {
  TVariant V = GetVarValue();
  switch (V.VarType() & VarTypeMask) {
  case 9: return LoadResString(SDispatch);
  case varUnknown: return LoadResString(SUnknown);
  case varBoolean: return BooleanIdents[V.AsBoolean() ? 1 : 0];
  default:
    try {
      return VarToStrDef(V, LoadResString(SNull));
    } catch (const EVariantTypeCastError&) {
      return LoadResString(SError);
    }
  }
}

void TVariantProperty::GetProperties(const TGetPropProc& Proc) { Proc(TVariantTypeProperty::CreateFor(*this)); }

void TVariantProperty::SetValue(const String& Value) {
  std::uint16_t Type = GetVarValue().VarType();
  TVariant V(Value);
  if (Value.empty()) {
    V = TVariant();
  } else if (SameText(Value, LoadResString(SNull))) {
    V = TVariant::Null();
  } else if (SameText(Value, LoadResString(SError)) || SameText(Value, LoadResString(SDispatch)) ||
             SameText(Value, LoadResString(SUnknown))) {
    return; // the text shown for a value that cannot be edited leaves it alone
  } else {
    (void)TryKeepType(Value, Type, V);
  }
  SetVarValue(V);
}

IPtr<IProperty> TVariantTypeProperty::CreateFor(TPropertyEditor& Parent) {
  IPtr<TVariantTypeProperty> Row = New<TVariantTypeProperty>();
  Row->CreateNested(Parent);
  return Row;
}

bool TVariantTypeProperty::AllEqual() {
  std::uint16_t First = GetVarValue().VarType();
  for (int I = 1; I < FPropCount; ++I)
    if (GetVarValueAt(I).VarType() != First) return false;
  return true;
}

String TVariantTypeProperty::GetValue() {
  int Code = GetVarValue().VarType() & VarTypeMask;
  if (Code < 21) return VariantTypeName(Code) ? VariantTypeName(Code) : "";
  if (Code == varUString) return LoadResString(SString);
  return LoadResString(SUnknown);
}

void TVariantTypeProperty::GetValues(const TGetStrProc& Proc) {
  for (int Code = 0; Code < 21; ++Code)
    if (const char* Name = VariantTypeName(Code)) Proc(Name);
  Proc(LoadResString(SString));
}

void TVariantTypeProperty::SetValue(const String& Value) {
  int Target = -1;
  for (int Code = 0; Code < 21 && Target < 0; ++Code)
    if (VariantTypeName(Code) && Value == VariantTypeName(Code)) Target = Code;
  if (Target < 0 && Value == LoadResString(SString)) Target = 0x0100;
  if (Target < 0) throw EDesignPropertyError(SUnknownType);
  TVariant V = GetVarValue();
  if (Target == varEmpty) V = TVariant();
  else if (Target == varNull) V = TVariant::Null();
  else {
    try {
      V = VarAsType(V, static_cast<std::uint16_t>(Target));
    } catch (const EVariantTypeCastError&) {
      V = VarAsType(TVariant(), static_cast<std::uint16_t>(Target)); // from a cleared value
    }
  }
  SetVarValue(V);
}

} // namespace formkit

namespace formkit {

//===----------------------------------------------------------------------===//
// TCollectionProperty
//===----------------------------------------------------------------------===//

TClass TCollectionProperty::GetEditorClass() { return DefaultCollectionEditorClass; }

TColOptions TCollectionProperty::GetColOptions() { return TColOptions{coAdd, coDelete, coMove}; }

void TCollectionProperty::Edit() {
  TPersistent* Walk = GetComponent(0);
  while (Walk && !dynamic_cast<TComponent*>(Walk)) Walk = Walk->GetOwner();
  auto* Collection = dynamic_cast<TCollection*>(GetObjectProp(GetComponent(0), GetPropInfo()));
  if (!ShowCollectionEditorProc || !Collection) return;
  ShowCollectionEditorProc(Designer(), GetEditorClass(), dynamic_cast<TComponent*>(Walk), Collection, GetName(),
                           GetColOptions());
}

} // namespace formkit
