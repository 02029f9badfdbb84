//===- editors/ScalarEditors.cpp - The standard editor of each value kind -===//
#include "editors/ScalarEditors.h"

#include "editors/EditorRegistry.h"
#include "platform/FormatSettings.h"

namespace formkit {

FK_IMPLEMENT(TOrdinalProperty, "DesignEditors") {}
FK_IMPLEMENT(TIntegerProperty, "DesignEditors") {}
FK_IMPLEMENT(TCharProperty, "DesignEditors") {}
FK_IMPLEMENT(TWideCharProperty, "DesignEditors") {}
FK_IMPLEMENT(TEnumProperty, "DesignEditors") {}
FK_IMPLEMENT(TBoolProperty, "DesignEditors") {}
FK_IMPLEMENT(TSetProperty, "DesignEditors") {}
FK_IMPLEMENT(TNestedProperty, "DesignEditors") {}
FK_IMPLEMENT(TSetElementProperty, "DesignEditors") {}
FK_IMPLEMENT(TInt64Property, "DesignEditors") {}
FK_IMPLEMENT(TFloatProperty, "DesignEditors") {}
FK_IMPLEMENT(TStringProperty, "DesignEditors") {}
FK_IMPLEMENT(TComponentNameProperty, "DesignEditors") {}
FK_IMPLEMENT(TWideStringProperty, "DesignEditors") {}
FK_IMPLEMENT(TClassProperty, "DesignEditors") {}
FK_IMPLEMENT(TDateProperty, "DesignEditors") {}
FK_IMPLEMENT(TTimeProperty, "DesignEditors") {}
FK_IMPLEMENT(TDateTimeProperty, "DesignEditors") {}

namespace {

/// True when every pair gives the value of the first by `Read(Index)`.
template <class Read> bool SameOverAllPairs(int Count, Read&& ReadAt) {
  if (Count <= 1) return true;
  auto First = ReadAt(0);
  for (int I = 1; I < Count; ++I)
    if (!(ReadAt(I) == First)) return false;
  return true;
}

/// The attributes that depend on a write accessor: `With` when the property has one,
/// else `Without`.
TPropertyAttributes ByWriteAccess(PPropInfo Prop, TPropertyAttributes With, TPropertyAttributes Without) {
  return Prop->IsWritable() ? With : Without;
}

/// The element type of a set property.
PTypeInfo SetElementType(PTypeInfo SetType) { return GetTypeData(SetType)->CompType(); }

[[noreturn]] void RaiseInvalidPropertyValue() { throw EDesignPropertyError(SInvalidPropertyValue); }

/// The code of a character property's text: empty is 0, one character its code, "#n" n.
std::int64_t ParseCharText(const String& Value) {
  WideString Wide = Utf8ToUtf16(Value);
  if (Wide.empty()) return 0;
  if (Wide.size() == 1) return Wide[0];
  int Code = 0;
  if (Value[0] != '#' || !TryStrToInt(std::string_view(Value).substr(1), Code)) RaiseInvalidPropertyValue();
  return Code;
}

/// "#n" for a character code.
String CodeText(int Code) { return Format("#%d", Code); }

} // namespace

int FloatPrecision(TFloatType Type) noexcept {
  switch (Type) {
  case ftSingle: return 7;
  case ftDouble: return 15;
  default: return 18;
  }
}

//===----------------------------------------------------------------------===//
// Ordinals
//===----------------------------------------------------------------------===//

bool TOrdinalProperty::AllEqual() {
  return SameOverAllPairs(FPropCount, [this](int I) { return GetOrdValueAt(I); });
}

String TIntegerProperty::GetValue() {
  if (GetTypeData(GetPropType())->OrdType == otULong) return IntToStr(static_cast<std::uint32_t>(GetOrdValue()));
  return IntToStr(GetOrdValue());
}

void TIntegerProperty::SetValue(const String& Value) {
  std::int64_t Number = 0;
  if (!TryStrToInt64(Value, Number)) throw EDesignPropertyError(SInvalidInteger, Value);
  const TTypeData* Data = GetTypeData(GetPropType());
  if (Data->OrdType == otULong) {
    std::int64_t Min = static_cast<std::uint32_t>(Data->MinValue);
    std::int64_t Max = static_cast<std::uint32_t>(Data->MaxValue);
    if (Number < Min || Number > Max) throw EDesignPropertyError(SOutOfRange, Min, Max);
  } else {
    std::int32_t Min = static_cast<std::int32_t>(Data->MinValue);
    std::int32_t Max = static_cast<std::int32_t>(Data->MaxValue);
    if (Number < Min || Number > Max) throw EDesignPropertyError(SOutOfRange, Min, Max);
  }
  SetOrdValue(static_cast<std::int32_t>(static_cast<std::uint32_t>(Number)));
}

String TCharProperty::GetValue() {
  int Code = static_cast<std::uint16_t>(GetOrdValue());
  if (Code >= 33 && Code <= 127) return String(1, static_cast<char>(Code));
  return CodeText(Code);
}

void TCharProperty::SetValue(const String& Value) {
  std::int64_t Code = ParseCharText(Value);
  const TTypeData* Data = GetTypeData(GetPropType());
  if (Code < Data->MinValue || Code > Data->MaxValue)
    throw EDesignPropertyError(SOutOfRange, Data->MinValue, Data->MaxValue);
  SetOrdValue(static_cast<std::int32_t>(Code));
}

WideString TWideCharProperty::GetValueW() {
  char16_t Code = static_cast<char16_t>(GetOrdValue());
  if (Code < 33) return Utf8ToUtf16(CodeText(Code));
  return WideString(1, Code);
}

TPropertyAttributes TEnumProperty::GetAttributes() {
  return ByWriteAccess(GetPropInfo(), {paValueList, paMultiSelect, paSortList, paRevertable},
                       {paMultiSelect, paSortList, paReadOnly, paDisplayReadOnly});
}

String TEnumProperty::GetValue() {
  const TTypeData* Data = GetTypeData(GetPropType());
  std::int64_t Value = GetOrdValue();
  if (Value < Data->MinValue || Value > Data->MaxValue) Value = Data->MaxValue;
  return GetEnumName(GetPropType(), Value);
}

void TEnumProperty::GetValues(const TGetStrProc& Proc) {
  PTypeInfo Type = GetPropType();
  const TTypeData* Data = GetTypeData(Type);
  // A Boolean-like type stored as a signed number offers false and true alone.
  std::int64_t Min = Data->MinValue < 0 ? 0 : Data->MinValue;
  std::int64_t Max = Data->MinValue < 0 ? 1 : Data->MaxValue;
  for (std::int64_t V = Min; V <= Max; ++V) Proc(GetEnumName(Type, V));
}

void TEnumProperty::SetValue(const String& Value) {
  const TTypeData* Data = GetTypeData(GetPropType());
  int Ordinal = GetEnumValue(GetPropType(), Value);
  if (Ordinal < Data->MinValue || Ordinal > Data->MaxValue) RaiseInvalidPropertyValue();
  SetOrdValue(Ordinal);
}

TPropertyAttributes TSetProperty::GetAttributes() {
  TPropertyAttributes With{paSubProperties, paMultiSelect, paReadOnly, paRevertable};
  return ByWriteAccess(GetPropInfo(), With, With + TPropertyAttributes{paDisplayReadOnly});
}

void TSetProperty::GetProperties(const TGetPropProc& Proc) {
  const TTypeData* Element = GetTypeData(SetElementType(GetPropType()));
  for (std::int64_t E = Element->MinValue; E <= Element->MaxValue; ++E)
    Proc(TSetElementProperty::CreateFor(*this, static_cast<int>(E)));
}

String TSetProperty::GetValue() {
  auto Set = static_cast<std::uint32_t>(GetOrdValue());
  std::int64_t Min = GetTypeData(SetElementType(GetPropType()))->MinValue;
  String Text = "[";
  for (int Bit = 0; Bit < 32; ++Bit) {
    if (!((Set >> Bit) & 1u)) continue;
    if (Text.size() != 1) Text += ",";
    Text += GetSetElementName(GetPropType(), static_cast<int>(Bit + Min));
  }
  return Text + "]";
}

//===----------------------------------------------------------------------===//
// Nested editors
//===----------------------------------------------------------------------===//

void TNestedProperty::CreateNested(TPropertyEditor& Parent) {
  Create(Parent.Designer(), 0);
  FParent = IPtr<IProperty>(static_cast<IProperty70*>(&Parent));
  SharePairsOf(Parent);
}

IPtr<IProperty> TSetElementProperty::CreateFor(TPropertyEditor& Parent, int Element) {
  IPtr<TSetElementProperty> Result = New<TSetElementProperty>();
  Result->CreateNested(Parent);
  Result->FElement = Element;
  Result->FBit = Element - static_cast<int>(GetTypeData(SetElementType(Parent.GetPropType()))->MinValue);
  return Result;
}

bool TSetElementProperty::AllEqual() {
  const std::uint32_t Mask = std::uint32_t(1) << FBit;
  return SameOverAllPairs(FPropCount, [&](int I) { return static_cast<std::uint32_t>(GetOrdValueAt(I)) & Mask; });
}

TPropertyAttributes TSetElementProperty::GetAttributes() {
  TPropertyAttributes With{paValueList, paMultiSelect, paSortList};
  return ByWriteAccess(GetPropInfo(), With, With + TPropertyAttributes{paReadOnly, paDisplayReadOnly});
}

String TSetElementProperty::GetName() { return GetSetElementName(GetPropType(), FElement); }

String TSetElementProperty::GetValue() {
  return BooleanIdents[(static_cast<std::uint32_t>(GetOrdValue()) >> FBit) & 1u];
}

void TSetElementProperty::GetValues(const TGetStrProc& Proc) {
  Proc(BooleanIdents[0]);
  Proc(BooleanIdents[1]);
}

void TSetElementProperty::SetValue(const String& Value) {
  auto Set = static_cast<std::uint32_t>(GetOrdValue());
  const std::uint32_t Mask = std::uint32_t(1) << FBit;
  Set = SameText(Value, BooleanIdents[1]) ? (Set | Mask) : (Set & ~Mask);
  SetOrdValue(static_cast<std::int32_t>(Set));
}

bool TSetElementProperty::GetIsDefault() {
  bool Result = TNestedProperty::GetIsDefault();
  if (Result) return true;
  PPropInfo Prop = GetPropInfo();
  // Only a declared default says what each element should be.
  if (!Prop->HasDefault || Prop->Stored == TStoredKind::ByMethod) return Result;
  const std::uint32_t Mask = std::uint32_t(1) << FBit;
  return (static_cast<std::uint32_t>(Prop->Default) & Mask) == (static_cast<std::uint32_t>(GetOrdValue()) & Mask);
}

//===----------------------------------------------------------------------===//
// Numbers, text, objects and dates
//===----------------------------------------------------------------------===//

bool TInt64Property::AllEqual() {
  return SameOverAllPairs(FPropCount, [this](int I) { return GetInt64ValueAt(I); });
}

String TInt64Property::GetValue() { return IntToStr(GetInt64Value()); }

void TInt64Property::SetValue(const String& Value) {
  std::int64_t Number = 0;
  if (!TryStrToInt64(Value, Number)) throw EDesignPropertyError(SInvalidInteger, Value);
  SetInt64Value(Number);
}

bool TFloatProperty::AllEqual() {
  return SameOverAllPairs(FPropCount, [this](int I) { return GetFloatValueAt(I); });
}

String TFloatProperty::GetValue() {
  int Digits = FloatPrecision(GetTypeData(GetPropType())->FloatType);
  return FloatToStrF(GetFloatValue(), ffGeneral, Digits, 0, FormatSettings());
}

void TFloatProperty::SetValue(const String& Value) {
  double Number = 0;
  if (!TryStrToFloat(Value, Number, FormatSettings())) throw EDesignPropertyError(SInvalidFloat, Value);
  SetFloatValue(Number);
}

bool TStringProperty::AllEqual() {
  return SameOverAllPairs(FPropCount, [this](int I) { return GetStrValueAt(I); });
}

int TStringProperty::GetEditLimit() {
  return GetKind() == tkString ? GetTypeData(GetPropType())->MaxLength : 2047;
}

bool TWideStringProperty::AllEqual() {
  return SameOverAllPairs(FPropCount, [this](int I) { return GetWideStrValueAt(I); });
}

TPropertyAttributes TClassProperty::GetAttributes() {
  return TPropertyAttributes{paSubProperties, paMultiSelect, paReadOnly};
}

void TClassProperty::GetProperties(const TGetPropProc& Proc) {
  IPtr<IDesignerSelections> Objects = CreateSelectionList();
  for (int I = 0; I < FPropCount; ++I)
    if (auto* Held = dynamic_cast<TPersistent*>(GetObjectProp(FPropList[I].Instance, FPropList[I].PropInfo)))
      Objects->Add(Held);
  if (Objects->GetCount() == 0) return;
  // Nested objects show no events.
  detail::EnumerateComponentProperties(Objects, tkAny - TTypeKinds{tkUnknown, tkMethod}, FDesigner, Proc, nullptr);
}

String TClassProperty::GetValue() { return Format("(%s)", GetPropType()->Name); }

namespace {
/// The shared text form of the three date editors: empty for 0, else `Show`.
template <class ShowFn> String DateText(double Value, ShowFn&& Show) {
  return Value == 0 ? String() : Show(Value, FormatSettings());
}

/// The shared parse of the three date editors: empty is 0, else `Parse` or `Message`.
template <class ParseFn> double ParseDateText(const String& Value, ParseFn&& Parse, const TResString& Message) {
  if (Value.empty()) return 0;
  TDateTime Result = 0;
  if (!Parse(Value, Result, FormatSettings())) throw EDesignPropertyError(Message, Value);
  return Result;
}
} // namespace

String TDateProperty::GetValue() { return DateText(GetFloatValue(), DateToStr); }
void TDateProperty::SetValue(const String& Value) { SetFloatValue(ParseDateText(Value, TryStrToDate, SInvalidDate)); }
String TTimeProperty::GetValue() { return DateText(GetFloatValue(), TimeToStr); }
void TTimeProperty::SetValue(const String& Value) { SetFloatValue(ParseDateText(Value, TryStrToTime, SInvalidTime)); }
String TDateTimeProperty::GetValue() { return DateText(GetFloatValue(), DateTimeToStr); }
void TDateTimeProperty::SetValue(const String& Value) {
  SetFloatValue(ParseDateText(Value, TryStrToDateTime, SInvalidDateTime));
}

} // namespace formkit
