//===- platform/TypInfoBuilder.h - Describing published members ----------===//
//
// The builder a class uses in `FK_IMPLEMENT` to publish its properties, events
// and methods, and the typed accessors behind the generic value access.
// Included by TypInfo.h; not meant to be included on its own.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/TypInfo.h"

namespace formkit {

namespace detail {

/// The value slot of a property's C++ type.
enum class TValueSlot { Ord, Float, Str, WStr, Variant, Method, Intf, None };

template <class V> struct IsEventPtr {
  template <class Sig> static std::true_type Test(const TEventPtr<Sig>*);
  static std::false_type Test(...);
  static constexpr bool value = decltype(Test(static_cast<const V*>(nullptr)))::value;
};
template <class V> struct IsIPtr : std::false_type {};
template <class I> struct IsIPtr<IPtr<I>> : std::true_type {};
template <class V> struct IsSet : std::false_type {};
template <class E, class S> struct IsSet<TSet<E, S>> : std::true_type {};

template <class V> constexpr TValueSlot SlotOf() {
  if constexpr (std::is_integral_v<V> || std::is_enum_v<V> || IsSet<V>::value ||
                (std::is_pointer_v<V> && std::is_base_of_v<TObject, std::remove_pointer_t<V>>))
    return TValueSlot::Ord;
  else if constexpr (std::is_floating_point_v<V>) return TValueSlot::Float;
  else if constexpr (std::is_same_v<V, String>) return TValueSlot::Str;
  else if constexpr (std::is_same_v<V, WideString>) return TValueSlot::WStr;
  else if constexpr (std::is_same_v<V, TVariant>) return TValueSlot::Variant;
  else if constexpr (IsEventPtr<V>::value) return TValueSlot::Method;
  else if constexpr (IsIPtr<V>::value) return TValueSlot::Intf;
  else return TValueSlot::None;
}

[[noreturn]] FK_API void RaiseWrongKind(const TPropInfo* Prop);
[[noreturn]] FK_API void RaiseReadOnly(const TPropInfo* Prop);
[[noreturn]] FK_API void RaiseWriteOnly(const TPropInfo* Prop);
[[noreturn]] FK_API void RaiseInvalidValue();

/// Reading and writing one property; one instance per (class, type, accessor).
class FK_API TPropAccess {
public:
  TPropAccess(const TPropInfo* Prop, bool CanRead, bool CanWrite)
      : FProp(Prop), FCanRead(CanRead), FCanWrite(CanWrite) {}
  virtual ~TPropAccess() = default;
  bool CanRead() const noexcept { return FCanRead; }
  bool CanWrite() const noexcept { return FCanWrite; }

  virtual std::int64_t GetOrd(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetOrd(TObject*, std::int64_t) const { RaiseWrongKind(FProp); }
  virtual double GetFloat(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetFloat(TObject*, double) const { RaiseWrongKind(FProp); }
  virtual String GetStr(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetStr(TObject*, const String&) const { RaiseWrongKind(FProp); }
  virtual WideString GetWStr(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetWStr(TObject*, const WideString&) const { RaiseWrongKind(FProp); }
  virtual TVariant GetVariant(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetVariant(TObject*, const TVariant&) const { RaiseWrongKind(FProp); }
  virtual TMethod GetMethod(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetMethod(TObject*, const TMethod&) const { RaiseWrongKind(FProp); }
  virtual IPtr<IInterface> GetIntf(TObject*) const { RaiseWrongKind(FProp); }
  virtual void SetIntf(TObject*, const IPtr<IInterface>&) const { RaiseWrongKind(FProp); }

protected:
  const TPropInfo* FProp;
  bool FCanRead;
  bool FCanWrite;
};

template <class G> struct AccessorValue;
template <class C, class V> struct AccessorValue<V C::*> {
  using Value = std::conditional_t<std::is_function_v<V>, void, std::remove_cv_t<V>>;
};
template <class C, class R> struct AccessorValue<R (C::*)() const> { using Value = std::decay_t<R>; };
template <class C, class R> struct AccessorValue<R (C::*)() const noexcept> { using Value = std::decay_t<R>; };

/// The typed accessor: `G` reads (a field or a const method), `S` writes (a field, a
/// method taking the value, or `std::nullptr_t` for read-only).
template <class T, class V, class G, class S> class TPropAccessImpl final : public TPropAccess {
public:
  TPropAccessImpl(const TPropInfo* Prop, G Getter, S Setter)
      : TPropAccess(Prop, !std::is_same_v<G, std::nullptr_t>, !std::is_same_v<S, std::nullptr_t>),
        FGetter(Getter), FSetter(Setter) {}

  V Read(TObject* O) const {
    if constexpr (std::is_same_v<G, std::nullptr_t>) {
      RaiseWriteOnly(FProp);
    } else {
      T* Obj = static_cast<T*>(O);
      if constexpr (std::is_member_function_pointer_v<G>) return (Obj->*FGetter)();
      else return Obj->*FGetter;
    }
  }
  void Write(TObject* O, V Value) const {
    if constexpr (std::is_same_v<S, std::nullptr_t>) {
      (void)O;
      (void)Value;
      RaiseReadOnly(FProp);
    } else {
      T* Obj = static_cast<T*>(O);
      if constexpr (std::is_member_function_pointer_v<S>) (Obj->*FSetter)(std::move(Value));
      else Obj->*FSetter = std::move(Value);
    }
  }

  static constexpr TValueSlot Slot = SlotOf<V>();

  std::int64_t GetOrd(TObject* O) const override {
    if constexpr (Slot == TValueSlot::Ord) {
      V Value = Read(O);
      if constexpr (IsSet<V>::value) return static_cast<std::int64_t>(Value.Mask());
      else if constexpr (std::is_pointer_v<V>)
        return static_cast<std::int64_t>(reinterpret_cast<std::intptr_t>(static_cast<TObject*>(Value)));
      // A character is a code unit of 0 to 255 whatever the sign of `char` here.
      else if constexpr (std::is_same_v<V, char>) return static_cast<unsigned char>(Value);
      else return static_cast<std::int64_t>(Value);
    } else return TPropAccess::GetOrd(O);
  }
  void SetOrd(TObject* O, std::int64_t Raw) const override {
    if constexpr (Slot == TValueSlot::Ord) {
      if constexpr (IsSet<V>::value) Write(O, V::FromMask(static_cast<std::uint64_t>(Raw)));
      else if constexpr (std::is_pointer_v<V>) Write(O, CheckedObject(reinterpret_cast<TObject*>(static_cast<std::intptr_t>(Raw))));
      else if constexpr (std::is_same_v<V, bool>) Write(O, Raw != 0);
      else Write(O, static_cast<V>(Raw));
    } else TPropAccess::SetOrd(O, Raw);
  }
  double GetFloat(TObject* O) const override {
    if constexpr (Slot == TValueSlot::Float) return Read(O);
    else return TPropAccess::GetFloat(O);
  }
  void SetFloat(TObject* O, double Value) const override {
    if constexpr (Slot == TValueSlot::Float) Write(O, static_cast<V>(Value));
    else TPropAccess::SetFloat(O, Value);
  }
  String GetStr(TObject* O) const override {
    if constexpr (Slot == TValueSlot::Str) return Read(O);
    else if constexpr (Slot == TValueSlot::WStr) return Utf16ToUtf8(Read(O));
    else return TPropAccess::GetStr(O);
  }
  void SetStr(TObject* O, const String& Value) const override {
    if constexpr (Slot == TValueSlot::Str) Write(O, Value);
    else if constexpr (Slot == TValueSlot::WStr) Write(O, Utf8ToUtf16(Value));
    else TPropAccess::SetStr(O, Value);
  }
  WideString GetWStr(TObject* O) const override {
    if constexpr (Slot == TValueSlot::WStr) return Read(O);
    else if constexpr (Slot == TValueSlot::Str) return Utf8ToUtf16(Read(O));
    else return TPropAccess::GetWStr(O);
  }
  void SetWStr(TObject* O, const WideString& Value) const override {
    if constexpr (Slot == TValueSlot::WStr) Write(O, Value);
    else if constexpr (Slot == TValueSlot::Str) Write(O, Utf16ToUtf8(Value));
    else TPropAccess::SetWStr(O, Value);
  }
  TVariant GetVariant(TObject* O) const override {
    if constexpr (Slot == TValueSlot::Variant) return Read(O);
    else return TPropAccess::GetVariant(O);
  }
  void SetVariant(TObject* O, const TVariant& Value) const override {
    if constexpr (Slot == TValueSlot::Variant) Write(O, Value);
    else TPropAccess::SetVariant(O, Value);
  }
  TMethod GetMethod(TObject* O) const override {
    if constexpr (Slot == TValueSlot::Method) return Read(O).Method();
    else return TPropAccess::GetMethod(O);
  }
  void SetMethod(TObject* O, const TMethod& Value) const override {
    if constexpr (Slot == TValueSlot::Method) Write(O, V(typename V::TEventPtr(Value)));
    else TPropAccess::SetMethod(O, Value);
  }
  IPtr<IInterface> GetIntf(TObject* O) const override {
    if constexpr (Slot == TValueSlot::Intf) return QueryAs<IInterface>(Read(O));
    else return TPropAccess::GetIntf(O);
  }
  void SetIntf(TObject* O, const IPtr<IInterface>& Value) const override {
    if constexpr (Slot == TValueSlot::Intf) {
      using I = std::remove_pointer_t<decltype(V().Get())>;
      V Typed = QueryAs<I>(Value);
      if (Value && !Typed) RaiseInvalidValue();
      Write(O, std::move(Typed));
    } else TPropAccess::SetIntf(O, Value);
  }

private:
  static V CheckedObject(TObject* Obj) {
    if constexpr (std::is_pointer_v<V>) {
      if (!Obj) return nullptr;
      using C = std::remove_pointer_t<V>;
      if (!Obj->InheritsFrom(C::StaticClass())) RaiseInvalidValue();
      return static_cast<V>(Obj);
    } else {
      return V{};
    }
  }
  G FGetter;
  S FSetter;
};

template <class T> TClass BuildClass(const char* Name, const char* Unit);

} // namespace detail

/// Refines a property just published: its type record, default and stored specifier.
/// Does not own the property record, which belongs to its class record.
class FK_API TPropBuilder {
public:
  explicit TPropBuilder(TPropInfo* Prop) : FProp(Prop) {}
  /// Names a subrange or alias type record instead of the one of the C++ type.
  TPropBuilder& Type(TTypeInfoFn TypeFn) {
    FProp->TypeFn = TypeFn;
    return *this;
  }
  /// The ordinal default: a value equal to it is not written.
  template <class V> TPropBuilder& Default(V Value) {
    if constexpr (detail::IsSet<V>::value) FProp->Default = static_cast<std::int64_t>(Value.Mask());
    else FProp->Default = static_cast<std::int64_t>(Value);
    FProp->HasDefault = true;
    return *this;
  }
  TPropBuilder& NoDefault() {
    FProp->HasDefault = false;
    return *this;
  }
  /// A constant stored specifier.
  TPropBuilder& Stored(bool Value) {
    FProp->Stored = Value ? TStoredKind::Always : TStoredKind::Never;
    return *this;
  }
  /// A stored specifier computed per instance.
  TPropBuilder& Stored(bool (*Fn)(TObject*)) {
    FProp->Stored = TStoredKind::ByMethod;
    FProp->StoredFn = Fn;
    return *this;
  }

private:
  TPropInfo* FProp;
};

/// Describes the published members of class `T` while its record is built.
template <class T> class TClassBuilder {
public:
  explicit TClassBuilder(TClass Rec) : FRec(Rec) {}

  /// A property read and written through `Getter` and `Setter`: each a member field, a
  /// const getter, a setter method, or `nullptr` for none.
  template <class G, class S = std::nullptr_t>
  TPropBuilder Property(const char* Name, G Getter, S Setter = nullptr) {
    return AddProperty<typename detail::AccessorValue<G>::Value>(Name, Getter, Setter);
  }
  /// A property that can only be written, through `Setter` (a field or a setter method);
  /// a read raises `EPropWriteOnly`.
  template <class V, class S> TPropBuilder WriteOnly(const char* Name, S Setter) {
    return AddProperty<V>(Name, nullptr, Setter);
  }
  /// A property read and written through one field.
  template <class V, class C> TPropBuilder Field(const char* Name, V C::*Member) {
    return Property(Name, Member, Member);
  }
  /// An event: a method-pointer property kept in a field.
  template <class V, class C> TPropBuilder Event(const char* Name, V C::*Member) {
    static_assert(detail::IsEventPtr<V>::value, "an event field must be an FK_EVENT type");
    return Property(Name, Member, Member);
  }
  /// Publishes method `M` under `Name` in the class's method table.
  template <auto M> void Method(const char* Name) {
    using Thunk = detail::MethodThunk<M>;
    FRec->Methods.push_back(TMethodEntry{Name, reinterpret_cast<void*>(&Thunk::Invoke), nullptr,
                                         detail::SignatureId<typename Thunk::Signature>()});
  }

private:
  template <class V, class G, class S> TPropBuilder AddProperty(const char* Name, G Getter, S Setter) {
    static_assert(detail::SlotOf<V>() != detail::TValueSlot::None, "no property kind for this type");
    auto Prop = std::make_unique<TPropInfo>();
    Prop->Name = Name;
    Prop->TypeFn = &TypeInfo<V>;
    Prop->Declaring = FRec;
    Prop->Access = std::make_unique<detail::TPropAccessImpl<T, V, G, S>>(Prop.get(), Getter, Setter);
    return TPropBuilder(FRec->AddOwnProperty(std::move(Prop)));
  }

  TClass FRec;
};

namespace detail {
FK_API TClass NewCompiledRecord(TClass Parent, const char* Name, const char* Unit,
                                TObject* (*Factory)());
template <class T> TClass BuildClass(const char* Name, const char* Unit) {
  TClass Rec = NewCompiledRecord(T::inherited::StaticClass(), Name, Unit, &Allocate<T>);
  TClassBuilder<T> B(Rec);
  T::DescribeClass(B);
  Rec->FinishProperties();
  return Rec;
}
} // namespace detail

} // namespace formkit
