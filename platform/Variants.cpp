//===- platform/Variants.cpp - Values of varying type ---------------------===//
#include "platform/Variants.h"

#include <cmath>
#include <cstdio>

namespace formkit {

FK_RESOURCESTRING(SVarTypeCouldNotConvert, "Could not convert variant of type (%s) into type (%s)");

String VarTypeAsText(TVarType Type) {
  switch (Type) {
  case varEmpty: return "Empty";
  case varNull: return "Null";
  case varInteger: return "Integer";
  case varDouble: return "Double";
  case varDate: return "Date";
  case varBoolean: return "Boolean";
  case varUnknown: return "Unknown";
  case varInt64: return "Int64";
  case varUString: return "UnicodeString";
  }
  return "Unknown";
}

TVarType TVariant::VarType() const noexcept {
  static constexpr TVarType Codes[] = {varEmpty,  varNull,    varInteger, varInt64, varDouble,
                                       varDate,   varBoolean, varUString, varUnknown};
  return Codes[FValue.index()];
}

void TVariant::CastError(TVarType To) const {
  throw EVariantTypeCastError(SVarTypeCouldNotConvert, VarTypeAsText(VarType()), VarTypeAsText(To));
}

namespace {
String FloatText(double V) {
  char Buf[64];
  std::snprintf(Buf, sizeof Buf, "%.15G", V);
  return Buf;
}
} // namespace

String TVariant::AsString() const {
  switch (FValue.index()) {
  case 0: return "";
  case 2: return std::to_string(std::get<std::int32_t>(FValue));
  case 3: return std::to_string(std::get<std::int64_t>(FValue));
  case 4: return FloatText(std::get<double>(FValue));
  case 5: return FloatText(std::get<TDate>(FValue).Value);
  case 6: return std::get<bool>(FValue) ? "True" : "False";
  case 7: return std::get<String>(FValue);
  default: CastError(varUString);
  }
}

std::int64_t TVariant::AsInt64() const {
  switch (FValue.index()) {
  case 0: return 0;
  case 2: return std::get<std::int32_t>(FValue);
  case 3: return std::get<std::int64_t>(FValue);
  case 4:
  case 5: {
    double D = FValue.index() == 4 ? std::get<double>(FValue) : std::get<TDate>(FValue).Value;
    if (!(D > -9.2e18 && D < 9.2e18)) CastError(varInt64);
    return static_cast<std::int64_t>(std::llround(D));
  }
  case 6: return std::get<bool>(FValue) ? -1 : 0;
  case 7: {
    const String& S = std::get<String>(FValue);
    if (SameText(S, "True")) return -1;
    if (SameText(S, "False")) return 0;
    try {
      return StrToInt64(S);
    } catch (const EConvertError&) {
      CastError(varInt64);
    }
  }
  default: CastError(varInt64);
  }
}

std::int32_t TVariant::AsInteger() const {
  std::int64_t V = AsInt64();
  if (V < INT32_MIN || V > INT32_MAX) CastError(varInteger);
  return static_cast<std::int32_t>(V);
}

double TVariant::AsDouble() const {
  switch (FValue.index()) {
  case 0: return 0;
  case 2: return std::get<std::int32_t>(FValue);
  case 3: return static_cast<double>(std::get<std::int64_t>(FValue));
  case 4: return std::get<double>(FValue);
  case 5: return std::get<TDate>(FValue).Value;
  case 6: return std::get<bool>(FValue) ? -1 : 0;
  case 7: {
    const String& S = std::get<String>(FValue);
    char* End = nullptr;
    double D = std::strtod(S.c_str(), &End);
    if (S.empty() || End != S.c_str() + S.size()) CastError(varDouble);
    return D;
  }
  default: CastError(varDouble);
  }
}

bool TVariant::AsBoolean() const {
  switch (FValue.index()) {
  case 6: return std::get<bool>(FValue);
  case 7: {
    const String& S = std::get<String>(FValue);
    if (SameText(S, "True")) return true;
    if (SameText(S, "False")) return false;
    return AsInt64() != 0;
  }
  case 1:
  case 8: CastError(varBoolean);
  default: return AsDouble() != 0;
  }
}

IPtr<IInterface> TVariant::AsInterface() const {
  if (FValue.index() == 0) return nullptr;
  if (auto* P = std::get_if<IPtr<IInterface>>(&FValue)) return *P;
  CastError(varUnknown);
}

bool operator==(const TVariant& A, const TVariant& B) { return A.FValue == B.FValue; }

TVariant VarAsType(const TVariant& V, std::uint16_t To) {
  switch (To) {
  case varEmpty: return TVariant();
  case varNull: return TVariant::Null();
  case varInteger: return TVariant(V.AsInteger());
  case varInt64: return TVariant(V.AsInt64());
  case varDouble: return TVariant(V.AsDouble());
  case varDate: return TVariant::Date(V.AsDouble());
  case varBoolean: return TVariant(V.AsBoolean());
  case 0x0100: // the 8-bit string: every string of the library is UTF-8
  case varUString: return TVariant(V.AsString());
  default:
    throw EVariantTypeCastError(SVarTypeCouldNotConvert, VarTypeAsText(V.VarType()),
                                VarTypeAsText(static_cast<TVarType>(To)));
  }
}

String VarToStrDef(const TVariant& V, const String& Default) { return V.IsNull() ? Default : V.AsString(); }

} // namespace formkit
