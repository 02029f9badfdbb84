//===- platform/TypInfo.cpp - Run-time type information and properties ---===//
#include "platform/TypInfo.h"
#include "platform/Rtti.h"

#include <algorithm>
#include <cctype>

namespace formkit {

FK_RESOURCESTRING(SUnknownProperty, "Unknown property: %s");
FK_RESOURCESTRING(SInvalidPropertyType, "Invalid property type: %s");
FK_RESOURCESTRING(SReadOnlyProperty, "Property %s is read-only");
FK_RESOURCESTRING(SWriteOnlyProperty, "Property %s is write-only");
FK_RESOURCESTRING(SInvalidPropertyElement, "Invalid property element: %s");
FK_RESOURCESTRING(SMethodTokenCall, "Method %s of a generated class cannot be called");
FK_RESOURCESTRING(SMethodDoesNotFit, "Method %s does not fit");

namespace detail {

void RaiseWrongKind(const TPropInfo* Prop) { throw EPropertyConvertError(SInvalidPropertyType, Prop->PropType()->Name); }
void RaiseReadOnly(const TPropInfo* Prop) { throw EPropertyError(SReadOnlyProperty, Prop->Name); }
void RaiseWriteOnly(const TPropInfo* Prop) { throw EPropWriteOnly(SWriteOnlyProperty, Prop->Name); }
void RaiseInvalidValue() { throw EPropertyConvertError(SInvalidPropertyValue); }

void RaiseTokenCall(const TMethod& M) {
  String Name;
  if (M.Data) Name = static_cast<TObject*>(M.Data)->MethodName(M.Code);
  throw EMethodTokenCall(SMethodTokenCall, Name);
}

//===----------------------------------------------------------------------===//
// Type records of built-in and declared types
//===----------------------------------------------------------------------===//

PTypeInfo MakeOrdinalType(const char* Name, TTypeKind Kind, TOrdType Ord, std::int64_t Min, std::int64_t Max) {
  auto* Info = new TTypeInfo; // immortal, like every type record
  Info->Kind = Kind;
  Info->Name = Name;
  Info->Data.OrdType = Ord;
  Info->Data.MinValue = Min;
  Info->Data.MaxValue = Max;
  RememberType(Info, Info->Name);
  return Info;
}

PTypeInfo MakeSimpleType(const char* Name, TTypeKind Kind) {
  auto* Info = new TTypeInfo;
  Info->Kind = Kind;
  Info->Name = Name;
  RememberType(Info, Info->Name);
  return Info;
}

namespace {
/// Splits "a, b, c" (a macro's stringified list) into trimmed names; `= value` parts are dropped.
std::vector<String> SplitNames(std::string_view List) {
  std::vector<String> Names;
  size_t Start = 0;
  while (Start <= List.size()) {
    size_t Comma = List.find(',', Start);
    if (Comma == std::string_view::npos) Comma = List.size();
    std::string_view Item = List.substr(Start, Comma - Start);
    size_t Eq = Item.find('=');
    if (Eq != std::string_view::npos) Item = Item.substr(0, Eq);
    String Name = Trim(Item);
    if (!Name.empty()) Names.push_back(Name);
    Start = Comma + 1;
  }
  return Names;
}
} // namespace

PTypeInfo MakeEnumType(const char* Name, TOrdType Ord, const char* Names, TTypeInfoFn Self) {
  auto* Info = new TTypeInfo;
  Info->Kind = tkEnumeration;
  Info->Name = Name;
  Info->Data.OrdType = Ord;
  Info->Data.EnumNames = SplitNames(Names);
  Info->Data.MinValue = 0;
  Info->Data.MaxValue = static_cast<std::int64_t>(Info->Data.EnumNames.size()) - 1;
  Info->Data.BaseType = Self;
  RememberType(Info, Info->Name);
  return Info;
}

PTypeInfo MakeSetType(const char* Name, TTypeInfoFn Comp) {
  auto* Info = new TTypeInfo;
  Info->Kind = tkSet;
  Info->Name = Name;
  Info->Data.CompType = Comp;
  Info->Data.OrdType = otULong;
  RememberType(Info, Info->Name);
  return Info;
}

PTypeInfo MakeInterfaceType(const char* Name, const TGUID& Guid, TTypeInfoFn Parent) {
  auto* Info = new TTypeInfo;
  Info->Kind = tkInterface;
  Info->Name = Name;
  Info->Data.Guid = Guid;
  Info->Data.IntfParent = Parent;
  RememberType(Info, Info->Name);
  return Info;
}

namespace {

/// The framework's name of a C++ parameter type written in a signature.
String FrameworkTypeName(String CppType) {
  static const std::pair<const char*, const char*> Names[] = {
      {"int", "Integer"},          {"int32_t", "Integer"},     {"std::int32_t", "Integer"},
      {"unsigned", "Cardinal"},    {"uint32_t", "Cardinal"},   {"std::uint32_t", "Cardinal"},
      {"int64_t", "Int64"},        {"std::int64_t", "Int64"},  {"bool", "Boolean"},
      {"double", "Double"},        {"float", "Single"},        {"char", "AnsiChar"},
      {"char16_t", "Char"},        {"String", "string"},       {"WideString", "WideString"},
      {"TVariant", "Variant"},     {"uint8_t", "Byte"},        {"std::uint8_t", "Byte"},
      {"int16_t", "SmallInt"},     {"uint16_t", "Word"},       {"void*", "Pointer"},
      {"TObject*", "TObject"},
  };
  size_t Colon = CppType.rfind("::");
  if (CppType.rfind("std::", 0) != 0 && Colon != String::npos) CppType = CppType.substr(Colon + 2);
  for (auto& [Cpp, Name] : Names)
    if (CppType == Cpp) return Name;
  if (CppType.rfind("IPtr<", 0) == 0 && CppType.back() == '>')
    return FrameworkTypeName(Trim(CppType.substr(5, CppType.size() - 6)));
  if (!CppType.empty() && CppType.back() == '*') return Trim(CppType.substr(0, CppType.size() - 1));
  return CppType;
}

void PutShortString(std::vector<std::uint8_t>& Out, const String& S) {
  size_t Len = std::min<size_t>(S.size(), 255);
  Out.push_back(static_cast<std::uint8_t>(Len));
  Out.insert(Out.end(), S.begin(), S.begin() + static_cast<std::ptrdiff_t>(Len));
}

/// Splits a parameter list at top-level commas (commas inside <> belong to templates).
std::vector<String> SplitParams(std::string_view List) {
  std::vector<String> Out;
  int Depth = 0;
  String Cur;
  for (char C : List) {
    if (C == '<' || C == '(') ++Depth;
    if (C == '>' || C == ')') --Depth;
    if (C == ',' && Depth == 0) {
      Out.push_back(Trim(Cur));
      Cur.clear();
    } else {
      Cur.push_back(C);
    }
  }
  if (!Trim(Cur).empty()) Out.push_back(Trim(Cur));
  return Out;
}

} // namespace

PTypeInfo MakeMethodType(const char* Name, const char* Signature, const void* SignatureId) {
  auto* Info = new TTypeInfo;
  Info->Kind = tkMethod;
  Info->Name = Name;
  Info->Data.SignatureId = SignatureId;
  std::string_view Sig(Signature);
  size_t Open = Sig.find('(');
  size_t Close = Sig.rfind(')');
  String Result = Trim(Sig.substr(0, Open));
  std::vector<String> Params = SplitParams(Sig.substr(Open + 1, Close - Open - 1));
  if (Params.size() == 1 && Params[0] == "void") Params.clear();
  auto& Out = Info->Data.MethodData;
  Out.push_back(Result == "void" ? mkProcedure : mkFunction);
  Out.push_back(static_cast<std::uint8_t>(Params.size()));
  for (String P : Params) {
    TParamFlags Flags;
    bool IsConst = P.rfind("const ", 0) == 0;
    if (IsConst) P = Trim(P.substr(6));
    // The name is the trailing identifier; the rest is the type.
    size_t End = P.size();
    size_t Begin = End;
    while (Begin > 0 && (std::isalnum(static_cast<unsigned char>(P[Begin - 1])) || P[Begin - 1] == '_')) --Begin;
    String ParamName = P.substr(Begin);
    String Type = Trim(P.substr(0, Begin));
    if (!Type.empty() && Type.back() == '&') {
      Type = Trim(Type.substr(0, Type.size() - 1));
      Flags.Include(IsConst ? pfConst : pfVar);
    } else if (IsConst) {
      Flags.Include(pfConst);
    }
    Out.push_back(static_cast<std::uint8_t>(Flags.Mask()));
    PutShortString(Out, ParamName);
    PutShortString(Out, FrameworkTypeName(Type));
  }
  PutShortString(Out, Result == "void" ? String() : FrameworkTypeName(Result));
  RememberType(Info, Info->Name);
  return Info;
}

} // namespace detail

// Built-in type records.
PTypeInfo FK_TypeInfo(const std::int8_t*) { static PTypeInfo I = detail::MakeOrdinalType("ShortInt", tkInteger, otSByte, -128, 127); return I; }
PTypeInfo FK_TypeInfo(const std::uint8_t*) { static PTypeInfo I = detail::MakeOrdinalType("Byte", tkInteger, otUByte, 0, 255); return I; }
PTypeInfo FK_TypeInfo(const std::int16_t*) { static PTypeInfo I = detail::MakeOrdinalType("SmallInt", tkInteger, otSWord, -32768, 32767); return I; }
PTypeInfo FK_TypeInfo(const std::uint16_t*) { static PTypeInfo I = detail::MakeOrdinalType("Word", tkInteger, otUWord, 0, 65535); return I; }
PTypeInfo FK_TypeInfo(const std::int32_t*) { static PTypeInfo I = detail::MakeOrdinalType("Integer", tkInteger, otSLong, INT32_MIN, INT32_MAX); return I; }
PTypeInfo FK_TypeInfo(const std::uint32_t*) { static PTypeInfo I = detail::MakeOrdinalType("Cardinal", tkInteger, otULong, 0, UINT32_MAX); return I; }
PTypeInfo FK_TypeInfo(const std::int64_t*) { static PTypeInfo I = detail::MakeOrdinalType("Int64", tkInt64, otSLong, INT64_MIN, INT64_MAX); return I; }
PTypeInfo FK_TypeInfo(const char*) { static PTypeInfo I = detail::MakeOrdinalType("AnsiChar", tkChar, otUByte, 0, 255); return I; }
PTypeInfo FK_TypeInfo(const char16_t*) { static PTypeInfo I = detail::MakeOrdinalType("Char", tkWChar, otUWord, 0, 65535); return I; }
PTypeInfo FK_TypeInfo(const bool*) {
  static PTypeInfo I = detail::MakeEnumType("Boolean", otUByte, "False, True", [] { return FK_TypeInfo(static_cast<const bool*>(nullptr)); });
  return I;
}
PTypeInfo FK_TypeInfo(const double*) {
  static PTypeInfo I = [] { auto* T = const_cast<TTypeInfo*>(detail::MakeSimpleType("Double", tkFloat)); T->Data.FloatType = ftDouble; return T; }();
  return I;
}
PTypeInfo FK_TypeInfo(const float*) {
  static PTypeInfo I = [] { auto* T = const_cast<TTypeInfo*>(detail::MakeSimpleType("Single", tkFloat)); T->Data.FloatType = ftSingle; return T; }();
  return I;
}
PTypeInfo FK_TypeInfo(const String*) { static PTypeInfo I = detail::MakeSimpleType("string", tkUString); return I; }
PTypeInfo FK_TypeInfo(const WideString*) { static PTypeInfo I = detail::MakeSimpleType("WideString", tkWString); return I; }
PTypeInfo FK_TypeInfo(const TVariant*) { static PTypeInfo I = detail::MakeSimpleType("Variant", tkVariant); return I; }

//===----------------------------------------------------------------------===//
// Introspection
//===----------------------------------------------------------------------===//

bool TPropInfo::IsReadable() const noexcept { return Access && Access->CanRead(); }
bool TPropInfo::IsWritable() const noexcept { return Access && Access->CanWrite(); }

namespace {
TClass ClassOfInfo(PTypeInfo Info) {
  return (Info && Info->Kind == tkClass) ? Info->Data.ClassRef : nullptr;
}
} // namespace

int GetPropList(PTypeInfo Info, TTypeKinds Kinds, std::vector<PPropInfo>* List, bool Sorted) {
  TClass Class = ClassOfInfo(Info);
  if (!Class) return 0;
  const auto& Source = Sorted ? Class->SortedProperties() : Class->Properties();
  int Count = 0;
  for (PPropInfo P : Source) {
    if (Kinds != tkAny && !Kinds.Contains(P->Kind())) continue; // every kind: no type to resolve
    ++Count;
    if (List) List->push_back(P);
  }
  return Count;
}

std::vector<PPropInfo> GetPropInfos(PTypeInfo Info) {
  TClass Class = ClassOfInfo(Info);
  return Class ? Class->Properties() : std::vector<PPropInfo>{};
}

PPropInfo GetPropInfo(PTypeInfo Info, std::string_view Name, TTypeKinds Kinds) {
  TClass Class = ClassOfInfo(Info);
  PPropInfo P = Class ? Class->FindProperty(Name) : nullptr;
  return (P && Kinds.Contains(P->Kind())) ? P : nullptr;
}

PPropInfo GetPropInfo(const TObject* Instance, std::string_view Name, TTypeKinds Kinds) {
  return Instance ? GetPropInfo(Instance->ClassType()->TypeInfo(), Name, Kinds) : nullptr;
}

bool IsPublishedProp(const TObject* Instance, std::string_view Name) { return GetPropInfo(Instance, Name) != nullptr; }

PPropInfo FindPropInfo(const TObject* Instance, std::string_view Name) {
  PPropInfo P = GetPropInfo(Instance, Name);
  if (!P) throw EPropertyError(SUnknownProperty, String(Name));
  return P;
}

bool IsStoredProp(TObject* Instance, PPropInfo Prop) {
  switch (Prop->Stored) {
  case TStoredKind::Always: return true;
  case TStoredKind::Never: return false;
  case TStoredKind::ByMethod: return Prop->StoredFn(Instance);
  }
  return true;
}

String GetEnumName(PTypeInfo Info, std::int64_t Value) {
  if (!Info) return "";
  if (Info->Kind == tkInteger || Info->Kind == tkInt64 || Info->Kind == tkChar || Info->Kind == tkWChar)
    return IntToStr(Value);
  if (Info->Kind != tkEnumeration) return "";
  PTypeInfo Base = Info->Data.BaseType ? Info->Data.BaseType() : Info;
  const auto& Names = Base->Data.EnumNames;
  if (Value < 0 || Value >= static_cast<std::int64_t>(Names.size())) return "";
  return Names[static_cast<size_t>(Value)];
}

int GetEnumValue(PTypeInfo Info, std::string_view Name) {
  if (!Info) return -1;
  if (Info->Kind == tkInteger) {
    try {
      return StrToInt(Name);
    } catch (const EConvertError&) {
      return -1;
    }
  }
  if (Info->Kind != tkEnumeration) return -1;
  PTypeInfo Base = Info->Data.BaseType ? Info->Data.BaseType() : Info;
  const auto& Names = Base->Data.EnumNames;
  for (size_t I = 0; I < Names.size(); ++I)
    if (SameText(Names[I], Name)) return static_cast<int>(I);
  return -1;
}

String GetSetElementName(PTypeInfo SetInfo, int Value) {
  if (!SetInfo || SetInfo->Kind != tkSet || !SetInfo->Data.CompType) return "";
  return GetEnumName(SetInfo->Data.CompType(), Value);
}

String SetToString(PTypeInfo SetInfo, std::uint64_t Value, bool Brackets) {
  String Out;
  for (int Bit = 0; Bit < 64; ++Bit) {
    if (!((Value >> Bit) & 1u)) continue;
    if (!Out.empty()) Out += ",";
    Out += GetSetElementName(SetInfo, Bit);
  }
  return Brackets ? "[" + Out + "]" : Out;
}

std::uint64_t StringToSet(PTypeInfo SetInfo, std::string_view Text) {
  String T = Trim(Text);
  if (!T.empty() && T.front() == '[') T = T.substr(1);
  if (!T.empty() && T.back() == ']') T.pop_back();
  std::uint64_t Value = 0;
  for (const String& Name : detail::SplitNames(T)) {
    int Bit = GetEnumValue(SetInfo->Data.CompType ? SetInfo->Data.CompType() : nullptr, Name);
    if (Bit < 0 || Bit > 63) throw EPropertyConvertError(SInvalidPropertyElement, Name);
    Value |= std::uint64_t(1) << Bit;
  }
  return Value;
}

TClass GetObjectPropClass(PPropInfo Prop) { return ClassOfInfo(Prop->PropType()); }

//===----------------------------------------------------------------------===//
// Value access
//===----------------------------------------------------------------------===//

std::int64_t GetOrdProp(TObject* I, PPropInfo P) { return P->Access->GetOrd(I); }
void SetOrdProp(TObject* I, PPropInfo P, std::int64_t V) { P->Access->SetOrd(I, V); }
String GetStrProp(TObject* I, PPropInfo P) { return P->Access->GetStr(I); }
void SetStrProp(TObject* I, PPropInfo P, const String& V) { P->Access->SetStr(I, V); }
WideString GetWideStrProp(TObject* I, PPropInfo P) { return P->Access->GetWStr(I); }
void SetWideStrProp(TObject* I, PPropInfo P, const WideString& V) { P->Access->SetWStr(I, V); }

String GetAnsiStrProp(TObject* I, PPropInfo P) {
  // The value slot would also serve a text field typed as another kind: the kind decides.
  if (!tkStrings.Contains(P->Kind())) detail::RaiseWrongKind(P);
  return P->Access->GetStr(I);
}

void SetAnsiStrProp(TObject* I, PPropInfo P, const String& V) {
  if (!tkStrings.Contains(P->Kind())) detail::RaiseWrongKind(P);
  P->Access->SetStr(I, V);
}

double GetFloatProp(TObject* I, PPropInfo P) { return P->Access->GetFloat(I); }
void SetFloatProp(TObject* I, PPropInfo P, double V) { P->Access->SetFloat(I, V); }
std::int64_t GetInt64Prop(TObject* I, PPropInfo P) { return P->Access->GetOrd(I); }
void SetInt64Prop(TObject* I, PPropInfo P, std::int64_t V) { P->Access->SetOrd(I, V); }
TVariant GetVariantProp(TObject* I, PPropInfo P) { return P->Access->GetVariant(I); }
void SetVariantProp(TObject* I, PPropInfo P, const TVariant& V) { P->Access->SetVariant(I, V); }
TMethod GetMethodProp(TObject* I, PPropInfo P) { return P->Access->GetMethod(I); }
void SetMethodProp(TObject* I, PPropInfo P, const TMethod& V) { P->Access->SetMethod(I, V); }
IPtr<IInterface> GetInterfaceProp(TObject* I, PPropInfo P) { return P->Access->GetIntf(I); }
void SetInterfaceProp(TObject* I, PPropInfo P, const IPtr<IInterface>& V) { P->Access->SetIntf(I, V); }

TObject* GetObjectProp(TObject* I, PPropInfo P) {
  if (P->Kind() != tkClass) detail::RaiseWrongKind(P);
  return reinterpret_cast<TObject*>(static_cast<std::intptr_t>(P->Access->GetOrd(I)));
}

void SetObjectProp(TObject* I, PPropInfo P, TObject* V) {
  if (P->Kind() != tkClass) detail::RaiseWrongKind(P);
  P->Access->SetOrd(I, static_cast<std::int64_t>(reinterpret_cast<std::intptr_t>(V)));
}

TMethod BindMethodByName(TObject* Obj, std::string_view Name, const void* SignatureId) {
  const TMethodEntry* M = Obj ? Obj->ClassType()->FindMethod(Name) : nullptr;
  if (!M) return {};
  if (M->SignatureId && SignatureId && M->SignatureId != SignatureId)
    throw EPropertyConvertError(SMethodDoesNotFit, String(Name));
  return TMethod{M->Code, Obj};
}

} // namespace formkit
