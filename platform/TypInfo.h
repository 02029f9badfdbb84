//===- platform/TypInfo.h - Run-time type information and properties -----===//
//
// Type records (`TTypeInfo`) of every kind a published property can have,
// property records (`TPropInfo`), the generic value access (`GetOrdProp`,
// `SetStrProp`, ...), enumeration names, and the builder with which a class
// describes its published members in `FK_IMPLEMENT`.
//
// Example:
//   FK_ENUM(TAlign, std::uint8_t, alNone, alTop, alBottom, alLeft, alRight, alClient)
//   FK_EVENT(TNotifyEvent, void(TObject* Sender));
//   FK_IMPLEMENT(TPanel, "KilnExtCtrls") {
//     B.Property("Align", &TPanel::FAlign).Default(alNone);
//     B.Event("OnClick", &TPanel::FOnClick);
//   }
//   GetEnumName(TypeInfo<TAlign>(), 2);   // "alBottom"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"
#include "platform/Sets.h"
#include "platform/Variants.h"

#include <memory>

namespace formkit {

//===----------------------------------------------------------------------===//
// Type records
//===----------------------------------------------------------------------===//

/// The kinds of type a property can have, in the order of the type information.
enum TTypeKind : std::uint8_t {
  tkUnknown, tkInteger, tkChar, tkEnumeration, tkFloat, tkString, tkSet, tkClass, tkMethod,
  tkWChar, tkLString, tkWString, tkVariant, tkArray, tkRecord, tkInterface, tkInt64, tkDynArray,
  tkUString, tkClassRef, tkPointer, tkProcedure, tkMRecord
};
using TTypeKinds = TSet<TTypeKind>;

/// Kinds that hold an ordinal value.
inline constexpr TTypeKinds tkOrdinal{tkInteger, tkChar, tkEnumeration, tkWChar, tkSet, tkInt64};
/// Kinds that hold a method pointer.
inline constexpr TTypeKinds tkMethods{tkMethod};
/// Kinds that hold text.
inline constexpr TTypeKinds tkStrings{tkString, tkLString, tkWString, tkUString};
/// Every kind a published property can have.
inline constexpr TTypeKinds tkProperties{tkInteger, tkChar,    tkEnumeration, tkFloat,  tkString,
                                         tkSet,     tkClass,   tkMethod,      tkWChar,  tkLString,
                                         tkWString, tkVariant, tkInterface,   tkInt64,  tkUString};
inline constexpr TTypeKinds tkAny = TTypeKinds::FromMask(~std::uint64_t(0));

enum TOrdType : std::uint8_t { otSByte, otUByte, otSWord, otUWord, otSLong, otULong };
enum TFloatType : std::uint8_t { ftSingle, ftDouble, ftExtended, ftComp, ftCurr };
enum TMethodKind : std::uint8_t {
  mkProcedure, mkFunction, mkConstructor, mkDestructor, mkClassProcedure, mkClassFunction
};
enum TParamFlag : std::uint8_t { pfVar, pfConst, pfArray, pfAddress, pfReference, pfOut, pfResult };
using TParamFlags = TSet<TParamFlag>;

using TTypeInfoFn = PTypeInfo (*)();

/// What a type record says beyond its kind and name; which fields matter depends on the kind.
struct FK_API TTypeData {
  /// Ordinal kinds: storage, bounds, and for enumerations the base type and the names.
  TOrdType OrdType = otSLong;
  std::int64_t MinValue = 0;
  std::int64_t MaxValue = 0;
  /// Short strings: the declared maximum length.
  int MaxLength = 255;
  TTypeInfoFn BaseType = nullptr;
  std::vector<String> EnumNames;
  /// Sets: the element type.
  TTypeInfoFn CompType = nullptr;
  /// Floats.
  TFloatType FloatType = ftDouble;
  /// Classes: the record the type describes.
  TClass ClassRef = nullptr;
  /// Methods: the method kind byte, the parameter count, for each parameter its flag
  /// byte, short-string name and short-string type name, then the short-string result
  /// type (empty for a procedure). Short strings are a length byte and UTF-8 bytes.
  std::vector<std::uint8_t> MethodData;
  /// Identity of the signature's C++ function type, for checked binding by name.
  const void* SignatureId = nullptr;
  /// Interfaces.
  TGUID Guid;
  TTypeInfoFn IntfParent = nullptr;
  String IntfUnit;
};

/// A type record. Records are immortal; identity is the address.
struct FK_API TTypeInfo {
  TTypeKind Kind = tkUnknown;
  String Name;
  TTypeData Data;
};

/// The data of a type record.
inline const TTypeData* GetTypeData(PTypeInfo Info) { return Info ? &Info->Data : nullptr; }

//===----------------------------------------------------------------------===//
// Property records
//===----------------------------------------------------------------------===//

namespace detail {
class TPropAccess;
}

/// How a property decides whether it is stored.
enum class TStoredKind : std::uint8_t { Always, Never, ByMethod };

/// A published property. Immortal for compiled classes.
struct FK_API TPropInfo {
  String Name;
  /// The type record, resolved on first use so a class may have a property typed by itself.
  TTypeInfoFn TypeFn = nullptr;
  /// The default of an ordinal property; meaningful only when `HasDefault`.
  std::int64_t Default = 0;
  bool HasDefault = false;
  TStoredKind Stored = TStoredKind::Always;
  bool (*StoredFn)(TObject*) = nullptr;
  /// Position among all properties of the declaring class, ancestors' first.
  int NameIndex = 0;
  /// The class that declares the property.
  TClass Declaring = nullptr;
  /// Reading and writing; owned by the property record.
  std::unique_ptr<const detail::TPropAccess> Access;

  PTypeInfo PropType() const { return TypeFn(); }
  TTypeKind Kind() const { return TypeFn()->Kind; }
  bool IsReadable() const noexcept;
  bool IsWritable() const noexcept;
};

//===----------------------------------------------------------------------===//
// Errors
//===----------------------------------------------------------------------===//

FK_EXCEPTION(EPropertyError, Exception);
FK_EXCEPTION(EPropertyConvertError, Exception);
/// The message of a value a property cannot take.
FK_RESOURCESTRING(SInvalidPropertyValue, "Invalid property value");
/// Raised by a read of a property that has no read accessor.
FK_EXCEPTION(EPropWriteOnly, EPropertyError);

//===----------------------------------------------------------------------===//
// Introspection
//===----------------------------------------------------------------------===//

/// The published properties of the class of `Info` whose kind is in `Kinds`; returns
/// their count. With `List` null only counts and writes nothing. `Sorted` orders by name
/// without regard to case, else declaration order with ancestors first.
FK_API int GetPropList(PTypeInfo Info, TTypeKinds Kinds, std::vector<PPropInfo>* List,
                       bool Sorted = true);
/// Every published property of a class, in declaration order.
FK_API std::vector<PPropInfo> GetPropInfos(PTypeInfo Info);
/// The property named `Name` (without regard to case), optionally of a kind in `Kinds`; null
/// when absent.
FK_API PPropInfo GetPropInfo(PTypeInfo Info, std::string_view Name, TTypeKinds Kinds = tkAny);
FK_API PPropInfo GetPropInfo(const TObject* Instance, std::string_view Name,
                             TTypeKinds Kinds = tkAny);
FK_API bool IsPublishedProp(const TObject* Instance, std::string_view Name);
inline String GetPropName(PPropInfo Prop) { return Prop->Name; }
inline String GetTypeName(PTypeInfo Info) { return Info->Name; }
/// Whether the property is stored for this instance (its stored specifier).
FK_API bool IsStoredProp(TObject* Instance, PPropInfo Prop);
/// The name of enumeration value `Value`; for integers, the number as text; empty when out of range.
FK_API String GetEnumName(PTypeInfo Info, std::int64_t Value);
/// The value of enumeration name `Name` without regard to case, or -1.
FK_API int GetEnumValue(PTypeInfo Info, std::string_view Name);
/// The name of element `Value` of a set type's element type.
FK_API String GetSetElementName(PTypeInfo SetInfo, int Value);
/// Set values as text: "[akLeft,akTop]"; and back (raises `EPropertyConvertError`
/// "Invalid property element: %s" for an unknown name).
FK_API String SetToString(PTypeInfo SetInfo, std::uint64_t Value, bool Brackets = true);
FK_API std::uint64_t StringToSet(PTypeInfo SetInfo, std::string_view Text);
/// The class of a class-valued property.
FK_API TClass GetObjectPropClass(PPropInfo Prop);

//===----------------------------------------------------------------------===//
// Value access
//===----------------------------------------------------------------------===//

/// Ordinal kinds (integer, char, wide char, enumeration, Boolean, set, Int64) and class
/// references (the object's address; `SetOrdProp(..., 0)` clears the reference).
FK_API std::int64_t GetOrdProp(TObject* Instance, PPropInfo Prop);
FK_API void SetOrdProp(TObject* Instance, PPropInfo Prop, std::int64_t Value);
/// Text kinds; wide strings convert from and to UTF-8.
FK_API String GetStrProp(TObject* Instance, PPropInfo Prop);
FK_API void SetStrProp(TObject* Instance, PPropInfo Prop, const String& Value);
FK_API WideString GetWideStrProp(TObject* Instance, PPropInfo Prop);
FK_API void SetWideStrProp(TObject* Instance, PPropInfo Prop, const WideString& Value);
/// The 8-bit form of a text property: short, long, wide and Unicode string kinds alike.
/// Every 8-bit string of this library is UTF-8, so "ansi" means UTF-8 bytes here, never a
/// code page: the value reads and writes exactly as through `GetStrProp`/`SetStrProp`, a
/// wide property converting from and to UTF-16, so that valid text of any script comes
/// back byte for byte. Any other kind raises `EPropertyConvertError`
/// "Invalid property type: %s" with the property's type name; the instance keeps its value.
FK_API String GetAnsiStrProp(TObject* Instance, PPropInfo Prop);
FK_API void SetAnsiStrProp(TObject* Instance, PPropInfo Prop, const String& Value);
FK_API double GetFloatProp(TObject* Instance, PPropInfo Prop);
FK_API void SetFloatProp(TObject* Instance, PPropInfo Prop, double Value);
FK_API std::int64_t GetInt64Prop(TObject* Instance, PPropInfo Prop);
FK_API void SetInt64Prop(TObject* Instance, PPropInfo Prop, std::int64_t Value);
FK_API TVariant GetVariantProp(TObject* Instance, PPropInfo Prop);
FK_API void SetVariantProp(TObject* Instance, PPropInfo Prop, const TVariant& Value);
FK_API TMethod GetMethodProp(TObject* Instance, PPropInfo Prop);
FK_API void SetMethodProp(TObject* Instance, PPropInfo Prop, const TMethod& Value);
FK_API TObject* GetObjectProp(TObject* Instance, PPropInfo Prop);
/// Raises `EPropertyConvertError` "Invalid property value" when `Value` is not of the
/// property's class.
FK_API void SetObjectProp(TObject* Instance, PPropInfo Prop, TObject* Value);
FK_API IPtr<IInterface> GetInterfaceProp(TObject* Instance, PPropInfo Prop);
FK_API void SetInterfaceProp(TObject* Instance, PPropInfo Prop, const IPtr<IInterface>& Value);

/// By name: raise `EPropertyError` "Unknown property: %s" when the class has none.
FK_API PPropInfo FindPropInfo(const TObject* Instance, std::string_view Name);

//===----------------------------------------------------------------------===//
// Method pointers with a signature
//===----------------------------------------------------------------------===//

FK_EXCEPTION(EMethodTokenCall, EInvalidOperation);

namespace detail {
/// One address per C++ function type: the identity of a signature.
template <class Sig> const void* SignatureId() {
  static const char Id = 0;
  return &Id;
}
template <auto M> struct MethodThunk;
template <class C, class R, class... A, R (C::*M)(A...)> struct MethodThunk<M> {
  using Class = C;
  using Signature = R(A...);
  static R Invoke(void* Data, A... Args) {
    return (static_cast<C*>(static_cast<TObject*>(Data))->*M)(std::forward<A>(Args)...);
  }
};
[[noreturn]] FK_API void RaiseTokenCall(const TMethod& M);
} // namespace detail

/// A typed method pointer; the base of every event type declared with `FK_EVENT`.
template <class Sig> class TEventPtr;
template <class R, class... A> class TEventPtr<R(A...)> {
public:
  using Signature = R(A...);
  TEventPtr() noexcept = default;
  explicit TEventPtr(const TMethod& M) noexcept : FMethod(M) {}

  /// Binds method `M` of `Obj`.
  template <auto M> static TEventPtr Bind(typename detail::MethodThunk<M>::Class* Obj) {
    static_assert(std::is_same_v<typename detail::MethodThunk<M>::Signature, Signature>,
                  "the method does not fit the event's signature");
    return TEventPtr(TMethod{reinterpret_cast<void*>(&detail::MethodThunk<M>::Invoke),
                             static_cast<TObject*>(Obj)});
  }

  const TMethod& Method() const noexcept { return FMethod; }
  bool IsAssigned() const noexcept { return FMethod.Code != nullptr; }
  explicit operator bool() const noexcept { return IsAssigned(); }
  void Clear() noexcept { FMethod = {}; }

  /// Calls the method; raises `EMethodTokenCall` for a token of a generated class.
  R operator()(A... Args) const {
    if (reinterpret_cast<std::uintptr_t>(FMethod.Code) < MaxMethodToken) detail::RaiseTokenCall(FMethod);
    return reinterpret_cast<R (*)(void*, A...)>(FMethod.Code)(FMethod.Data, std::forward<A>(Args)...);
  }
  friend bool operator==(const TEventPtr& X, const TEventPtr& Y) noexcept { return X.FMethod == Y.FMethod; }

private:
  TMethod FMethod;
};

/// Looks up published method `Name` of `Obj`'s class and binds it when its signature is
/// `Sig`. Returns an unassigned pointer when absent; raises `EPropertyConvertError`
/// "Method %s does not fit" when the signature differs.
FK_API TMethod BindMethodByName(TObject* Obj, std::string_view Name, const void* SignatureId);

//===----------------------------------------------------------------------===//
// Mapping C++ types to type records
//===----------------------------------------------------------------------===//

namespace detail {
FK_API PTypeInfo MakeOrdinalType(const char* Name, TTypeKind Kind, TOrdType Ord, std::int64_t Min,
                                 std::int64_t Max);
FK_API PTypeInfo MakeEnumType(const char* Name, TOrdType Ord, const char* Names, TTypeInfoFn Self);
FK_API PTypeInfo MakeSetType(const char* Name, TTypeInfoFn Comp);
FK_API PTypeInfo MakeMethodType(const char* Name, const char* Signature, const void* SignatureId);
FK_API PTypeInfo MakeInterfaceType(const char* Name, const TGUID& Guid, TTypeInfoFn Parent);
FK_API PTypeInfo MakeSimpleType(const char* Name, TTypeKind Kind);

template <class T> constexpr TOrdType OrdTypeOf() {
  if constexpr (sizeof(T) == 1) return std::is_signed_v<T> ? otSByte : otUByte;
  else if constexpr (sizeof(T) == 2) return std::is_signed_v<T> ? otSWord : otUWord;
  else return std::is_signed_v<T> ? otSLong : otULong;
}
} // namespace detail

// Built-in types. Found by overload on a null pointer of the type.
FK_API PTypeInfo FK_TypeInfo(const std::int8_t*);
FK_API PTypeInfo FK_TypeInfo(const std::uint8_t*);
FK_API PTypeInfo FK_TypeInfo(const std::int16_t*);
FK_API PTypeInfo FK_TypeInfo(const std::uint16_t*);
FK_API PTypeInfo FK_TypeInfo(const std::int32_t*);
FK_API PTypeInfo FK_TypeInfo(const std::uint32_t*);
FK_API PTypeInfo FK_TypeInfo(const std::int64_t*);
FK_API PTypeInfo FK_TypeInfo(const bool*);
FK_API PTypeInfo FK_TypeInfo(const char*);
FK_API PTypeInfo FK_TypeInfo(const char16_t*);
FK_API PTypeInfo FK_TypeInfo(const double*);
FK_API PTypeInfo FK_TypeInfo(const float*);
FK_API PTypeInfo FK_TypeInfo(const String*);
FK_API PTypeInfo FK_TypeInfo(const WideString*);
FK_API PTypeInfo FK_TypeInfo(const TVariant*);

namespace detail {
template <class T> struct TypeInfoOf {
  static PTypeInfo Get() { return FK_TypeInfo(static_cast<const T*>(nullptr)); }
};
template <class C>
  requires std::is_base_of_v<TObject, C>
struct TypeInfoOf<C*> {
  static PTypeInfo Get() { return C::StaticClass()->TypeInfo(); }
};
template <class I> struct TypeInfoOf<IPtr<I>> {
  static PTypeInfo Get() {
    static PTypeInfo Info = MakeInterfaceType(I::InterfaceName, I::IID, ParentFn());
    return Info;
  }
  static TTypeInfoFn ParentFn() {
    if constexpr (std::is_void_v<typename I::inherited>) return nullptr;
    else return &TypeInfoOf<IPtr<typename I::inherited>>::Get;
  }
};
} // namespace detail

/// The type record of a C++ type.
template <class T> PTypeInfo TypeInfo() { return detail::TypeInfoOf<T>::Get(); }
/// The type record of an interface.
template <class I> PTypeInfo InterfaceTypeInfo() { return TypeInfo<IPtr<I>>(); }

/// Declares a contiguous enumeration with its names: `FK_ENUM(TAlign, std::uint8_t, alNone, ...)`.
#define FK_ENUM(Name, Underlying, ...)                                                             \
  enum Name : Underlying { __VA_ARGS__ };                                                          \
  inline ::formkit::PTypeInfo FK_TypeInfo(const Name*) {                                           \
    static ::formkit::PTypeInfo Info = ::formkit::detail::MakeEnumType(                            \
        #Name, ::formkit::detail::OrdTypeOf<Underlying>(), #__VA_ARGS__,                           \
        [] { return FK_TypeInfo(static_cast<const Name*>(nullptr)); });                            \
    return Info;                                                                                   \
  }

/// Declares `Name` as a set of enumeration `Element` with its own type record.
#define FK_SET(Name, Element)                                                                      \
  using Name = ::formkit::TSet<Element>;                                                           \
  inline ::formkit::PTypeInfo FK_TypeInfo(const Name*) {                                           \
    static ::formkit::PTypeInfo Info =                                                             \
        ::formkit::detail::MakeSetType(#Name, &::formkit::TypeInfo<Element>);                      \
    return Info;                                                                                   \
  }

/// Declares an integer subrange type record `TypeInfo_Name()` for `.Type()`.
#define FK_SUBRANGE(Name, Underlying, Min, Max)                                                    \
  inline ::formkit::PTypeInfo TypeInfo_##Name() {                                                  \
    static ::formkit::PTypeInfo Info = ::formkit::detail::MakeOrdinalType(                         \
        #Name, ::formkit::tkInteger, ::formkit::detail::OrdTypeOf<Underlying>(), Min, Max);        \
    return Info;                                                                                   \
  }

/// Declares a type record `TypeInfo_Name()` that aliases a simple kind, e.g. a caption string.
#define FK_ALIAS(Name, Kind)                                                                       \
  inline ::formkit::PTypeInfo TypeInfo_##Name() {                                                  \
    static ::formkit::PTypeInfo Info = ::formkit::detail::MakeSimpleType(#Name, Kind);             \
    return Info;                                                                                   \
  }

/// Declares event type `Name` with its signature; parameter names, type names and
/// var (`T&`) / const (`const T&`) flags are recorded for event descriptions.
#define FK_EVENT(Name, ...)                                                                        \
  struct Name : ::formkit::TEventPtr<__VA_ARGS__> {                                                \
    using TEventPtr::TEventPtr;                                                                    \
    Name() noexcept = default;                                                                     \
    Name(const ::formkit::TEventPtr<__VA_ARGS__>& O) noexcept : TEventPtr(O) {}                    \
  };                                                                                               \
  inline ::formkit::PTypeInfo FK_TypeInfo(const Name*) {                                           \
    static ::formkit::PTypeInfo Info = ::formkit::detail::MakeMethodType(                          \
        #Name, #__VA_ARGS__, ::formkit::detail::SignatureId<__VA_ARGS__>());                      \
    return Info;                                                                                   \
  }

/// The type records of date and time values (`TDateTime` and its date and time forms), so
/// that editors can be registered for them.
FK_ALIAS(TDateTime, tkFloat)
FK_ALIAS(TDate, tkFloat)
FK_ALIAS(TTime, tkFloat)

} // namespace formkit

#include "platform/TypInfoBuilder.h"
