//===- platform/Variants.h - Values of varying type ----------------------===//
//
// `TVariant` holds nothing (unassigned), null, an integer, a 64-bit integer, a
// float, a date, a Boolean, a string or an interface reference, and converts
// between them as the run-time library does.
//
// Example:
//   TVariant V = 42;
//   String S = V.AsString();   // "42"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Interfaces.h"

#include <variant>

namespace formkit {

/// The type codes of variants.
enum TVarType : std::uint16_t {
  varEmpty = 0x0000,
  varNull = 0x0001,
  varInteger = 0x0003,
  varDouble = 0x0005,
  varDate = 0x0007,
  varBoolean = 0x000B,
  varUnknown = 0x000D,
  varInt64 = 0x0014,
  varUString = 0x0102,
};

FK_EXCEPTION(EVariantError, Exception);
FK_EXCEPTION(EVariantTypeCastError, EVariantError);

/// A value of varying type. Copying copies the value; an interface is counted.
class FK_API TVariant {
public:
  struct TNull {
    friend bool operator==(TNull, TNull) { return true; }
  };
  struct TDate {
    double Value;
    friend bool operator==(TDate, TDate) = default;
  };

  TVariant() noexcept = default;
  TVariant(int V) : FValue(static_cast<std::int32_t>(V)) {}
  TVariant(std::int64_t V) : FValue(V) {}
  TVariant(long long V) : FValue(static_cast<std::int64_t>(V)) {}
  TVariant(double V) : FValue(V) {}
  TVariant(bool V) : FValue(V) {}
  TVariant(const char* V) : FValue(String(V)) {}
  TVariant(String V) : FValue(std::move(V)) {}
  TVariant(IPtr<IInterface> V) : FValue(std::move(V)) {}
  static TVariant Null() { TVariant R; R.FValue = TNull{}; return R; }
  static TVariant Date(double V) { TVariant R; R.FValue = TDate{V}; return R; }

  /// The type code of the held value.
  TVarType VarType() const noexcept;
  bool IsEmpty() const noexcept { return FValue.index() == 0; }
  bool IsNull() const noexcept { return std::holds_alternative<TNull>(FValue); }

  /// Conversions; an impossible one raises `EVariantTypeCastError`
  /// "Could not convert variant of type (%s) into type (%s)".
  String AsString() const;
  std::int32_t AsInteger() const;
  std::int64_t AsInt64() const;
  double AsDouble() const;
  bool AsBoolean() const;
  /// The interface held, or null for an empty variant.
  IPtr<IInterface> AsInterface() const;

  /// Same type and equal value.
  friend bool operator==(const TVariant& A, const TVariant& B);

private:
  [[noreturn]] void CastError(TVarType To) const;
  std::variant<std::monostate, TNull, std::int32_t, std::int64_t, double, TDate, bool, String,
               IPtr<IInterface>>
      FValue;
};

/// `V` converted to type code `To`: empty, null, integer, Int64, double, date, Boolean or
/// string (256 and 258 both give the string). Raises `EVariantTypeCastError` for a
/// conversion that cannot be made and for a type this library's variants do not hold.
FK_API TVariant VarAsType(const TVariant& V, std::uint16_t To);
/// `V` as text; `Default` for a null value. Raises `EVariantTypeCastError` for an interface.
FK_API String VarToStrDef(const TVariant& V, const String& Default);

/// The name of a variant type code as the messages show it ("Integer", "UnicodeString", ...).
FK_API String VarTypeAsText(TVarType Type);

} // namespace formkit
