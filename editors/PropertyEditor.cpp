//===- editors/PropertyEditor.cpp - The base of every property editor ----===//
#include "editors/PropertyEditor.h"

#include "platform/Lists.h"
#include "platform/TypInfo.h"

#include <typeinfo>

namespace formkit {

FK_IMPLEMENT(TPropertyEditor, "DesignEditors") {}

//===----------------------------------------------------------------------===//
// Construction and the pairs
//===----------------------------------------------------------------------===//

void TPropertyEditor::Create(const IPtr<IDesigner>& ADesigner, int APropCount) {
  inherited::Create(ADesigner, APropCount);
  FDesigner = ADesigner;
  if (APropCount > 0) FOwnedPropList = std::make_unique<TInstProp[]>(static_cast<size_t>(APropCount));
  FPropList = FOwnedPropList.get();
  FPropCount = APropCount;
}

void TPropertyEditor::SetPropEntry(int Index, TPersistent* AInstance, PPropInfo APropInfo) {
  FPropList[Index] = {AInstance, APropInfo};
}

void TPropertyEditor::SharePairsOf(TPropertyEditor& Parent) noexcept {
  FPropList = Parent.FPropList;
  FPropCount = Parent.FPropCount;
}

//===----------------------------------------------------------------------===//
// Base behaviour
//===----------------------------------------------------------------------===//

std::int32_t TPropertyEditor::GetOrdValue() { return GetOrdValueAt(0); }

bool TPropertyEditor::AllEqual() { return FPropCount == 1; }

bool TPropertyEditor::AutoFill() { return GetPropInfo()->IsWritable(); }

void TPropertyEditor::Edit() {
  if (!AutoFill()) return;
  TObjectGuard<TStringList> Values(new TStringList);
  Values->SetSorted(GetAttributes().Contains(paSortList));
  GetValues([&](const String& S) { Values->Add(S); });
  if (Values->Count() == 0) return;
  // A value that is not in the list has index -1, so the step lands on the first entry.
  int Next = Values->IndexOf(GetValue()) + 1;
  if (Next == Values->Count()) Next = 0;
  SetValue(Values->Get(Next));
}

TPropertyAttributes TPropertyEditor::GetAttributes() {
  TPropertyAttributes Result{paMultiSelect, paRevertable};
  if (!GetPropInfo()->IsWritable()) Result = Result + TPropertyAttributes{paReadOnly, paDisplayReadOnly};
  return Result;
}

String TPropertyEditor::GetName() { return FPropList[0].PropInfo->Name; }

PPropInfo TPropertyEditor::GetPropInfo() { return FPropList[0].PropInfo; }

String TPropertyEditor::GetValue() { return LoadResString(srUnknown); }

WideString TPropertyEditor::GetValueW() { return Utf8ToUtf16(GetValue()); }

bool TPropertyEditor::HasInstance(TPersistent* Instance) {
  for (int I = 0; I < FPropCount; ++I)
    if (FPropList[I].Instance == Instance) return true;
  return false;
}

namespace {
/// `Text` in the string type of an edit value.
template <class S> S TextAs(const String& Text) {
  if constexpr (std::is_same_v<S, WideString>) return Utf8ToUtf16(Text);
  else return Text;
}

/// The safe read of both edit-value forms: the text of the read, or the reason it failed.
template <class S, class Read> bool SafeEditValue(TPropertyEditor& E, S& Value, Read&& ReadValue) {
  Value = S();
  try {
    Value = ReadValue();
    PPropInfo Prop = E.GetPropInfo();
    return Prop && Prop->IsWritable();
  } catch (const EPropWriteOnly&) {
    Value = TextAs<S>(LoadResString(sNotAvailable));
  } catch (const std::exception& Ex) {
    Value = TextAs<S>(Format("(%s)", String(Ex.what())));
  }
  return false;
}
} // namespace

bool TPropertyEditor::GetEditValue(String& Value) {
  return SafeEditValue(*this, Value, [&] { return GetValue(); });
}

bool TPropertyEditor::GetEditValueW(WideString& Value) {
  return SafeEditValue(*this, Value, [&] { return GetValueW(); });
}

PTypeInfo TPropertyEditor::GetPropType() { return FPropList[0].PropInfo->PropType(); }

TTypeKind TPropertyEditor::GetKind() { return GetPropType()->Kind; }

void TPropertyEditor::Revert() {
  if (!FDesigner) return;
  for (int I = 0; I < FPropCount; ++I) FDesigner->Revert(FPropList[I].Instance, FPropList[I].PropInfo);
}

bool TPropertyEditor::ValueAvailable() {
  // This runs for every pair of every listed editor: the component test is made once for
  // each run of objects of one C++ type, which costs one load per pair.
  const std::type_info* LastType = nullptr;
  bool LastIsComponent = false;
  for (int I = 0; I < FPropCount; ++I) {
    TPersistent* Instance = FPropList[I].Instance;
    if (const std::type_info* Type = &typeid(*Instance); Type != LastType) {
      LastType = Type;
      LastIsComponent = dynamic_cast<TComponent*>(Instance) != nullptr;
    }
    if (!LastIsComponent || !static_cast<TComponent*>(Instance)->ComponentStyle().Contains(csCheckPropAvail))
      continue;
    try {
      (void)GetValue();
      (void)AllEqual();
    } catch (...) {
      return false; // the component refuses to be read at design time
    }
    return true;
  }
  return true;
}

String TPropertyEditor::GetVisualValue() { return AllEqual() ? GetValue() : String(); }

String TPropertyEditor::GetPrivateDirectory() { return FDesigner ? FDesigner->GetPrivateDirectory() : String(); }

void TPropertyEditor::Modified() {
  if (FDesigner) FDesigner->Modified();
}

//===----------------------------------------------------------------------===//
// Typed access
//===----------------------------------------------------------------------===//

double TPropertyEditor::GetFloatValueAt(int I) { return GetFloatProp(FPropList[I].Instance, FPropList[I].PropInfo); }
std::int64_t TPropertyEditor::GetInt64ValueAt(int I) {
  return GetInt64Prop(FPropList[I].Instance, FPropList[I].PropInfo);
}
TMethod TPropertyEditor::GetMethodValueAt(int I) { return GetMethodProp(FPropList[I].Instance, FPropList[I].PropInfo); }
std::int32_t TPropertyEditor::GetOrdValueAt(int I) {
  return static_cast<std::int32_t>(GetOrdProp(FPropList[I].Instance, FPropList[I].PropInfo));
}
String TPropertyEditor::GetStrValueAt(int I) { return GetStrProp(FPropList[I].Instance, FPropList[I].PropInfo); }
WideString TPropertyEditor::GetWideStrValueAt(int I) {
  return GetWideStrProp(FPropList[I].Instance, FPropList[I].PropInfo);
}
TVariant TPropertyEditor::GetVarValueAt(int I) { return GetVariantProp(FPropList[I].Instance, FPropList[I].PropInfo); }
IPtr<IInterface> TPropertyEditor::GetIntfValueAt(int I) {
  return GetInterfaceProp(FPropList[I].Instance, FPropList[I].PropInfo);
}

void TPropertyEditor::SetFloatValue(double Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) { SetFloatProp(Obj, P, Value); });
}
void TPropertyEditor::SetInt64Value(std::int64_t Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) { SetInt64Prop(Obj, P, Value); });
}
void TPropertyEditor::SetMethodValue(const TMethod& Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) { SetMethodProp(Obj, P, Value); });
}
void TPropertyEditor::SetOrdValue(std::int32_t Value) {
  // The 32 bits are the stored pattern: an unsigned property gets them unsigned.
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) {
    const TTypeData* Data = GetTypeData(P->PropType());
    bool Unsigned = P->Kind() == tkInteger && Data->OrdType == otULong;
    SetOrdProp(Obj, P, Unsigned ? std::int64_t(static_cast<std::uint32_t>(Value)) : std::int64_t(Value));
  });
}
void TPropertyEditor::SetStrValue(const String& Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) {
    if (P->IsWritable()) SetStrProp(Obj, P, Value);
  });
}
void TPropertyEditor::SetWideStrValue(const WideString& Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) {
    if (P->IsWritable()) SetWideStrProp(Obj, P, Value);
  });
}
void TPropertyEditor::SetVarValue(const TVariant& Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) { SetVariantProp(Obj, P, Value); });
}
void TPropertyEditor::SetIntfValue(const IPtr<IInterface>& Value) {
  WriteAllPairs([&](TPersistent* Obj, PPropInfo P) { SetInterfaceProp(Obj, P, Value); });
}

} // namespace formkit
