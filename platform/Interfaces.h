//===- platform/Interfaces.h - Counted interfaces with fixed identities --===//
//
// `TGUID` identities parsed at compile time, the root interface `IInterface`,
// the counting smart pointer `IPtr<I>` and the `FK_INTERFACE` declaration.
// Version chains use single, non-virtual inheritance; each member names its
// parent and answers for every older identity of its chain. Casts by identity:
// `QueryAs` (null when missing), `Supports` (a Boolean), `CastAs` (raises when
// missing).
//
// Example:
//   struct FK_API IFoo60 : IInterface {
//     FK_INTERFACE(IFoo60, IInterface, "{8E1A4C6B-0D33-4A2E-9B51-6C0F2D7E4A10}")
//     virtual String Name() = 0;
//   };
//   IPtr<IFoo60> Foo = CastAs<IFoo60>(Obj);   // EIntfCastError when Obj has none
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <cstddef>
#include <type_traits>
#include <utility>

namespace formkit {

//===----------------------------------------------------------------------===//
// Identities
//===----------------------------------------------------------------------===//

/// A 128-bit interface identity, written "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}".
struct TGUID {
  std::uint32_t D1 = 0;
  std::uint16_t D2 = 0;
  std::uint16_t D3 = 0;
  std::uint8_t D4[8] = {};

  friend constexpr bool operator==(const TGUID& A, const TGUID& B) noexcept {
    if (A.D1 != B.D1 || A.D2 != B.D2 || A.D3 != B.D3) return false;
    for (int I = 0; I < 8; ++I)
      if (A.D4[I] != B.D4[I]) return false;
    return true;
  }

  /// Parses the braced form; a malformed literal does not compile.
  static consteval TGUID Parse(const char (&Text)[39]) { return ParseChecked(Text); }
  /// Parses at run time; raises `EConvertError` on a malformed text.
  static TGUID FromString(std::string_view Text);
  /// The braced, upper-case form.
  String ToString() const;

  static constexpr TGUID ParseChecked(const char* S) {
    auto Hex = [](char C) -> unsigned {
      if (C >= '0' && C <= '9') return C - '0';
      if (C >= 'a' && C <= 'f') return C - 'a' + 10;
      if (C >= 'A' && C <= 'F') return C - 'A' + 10;
      throw "malformed interface identity"; // not a constant expression: compile error
    };
    auto Expect = [](bool Ok) {
      if (!Ok) throw "malformed interface identity";
    };
    Expect(S[0] == '{' && S[9] == '-' && S[14] == '-' && S[19] == '-' && S[24] == '-' && S[37] == '}');
    auto Read = [&](int From, int Count) {
      std::uint64_t V = 0;
      for (int I = 0; I < Count; ++I) V = (V << 4) | Hex(S[From + I]);
      return V;
    };
    TGUID G;
    G.D1 = static_cast<std::uint32_t>(Read(1, 8));
    G.D2 = static_cast<std::uint16_t>(Read(10, 4));
    G.D3 = static_cast<std::uint16_t>(Read(15, 4));
    G.D4[0] = static_cast<std::uint8_t>(Read(20, 2));
    G.D4[1] = static_cast<std::uint8_t>(Read(22, 2));
    for (int I = 0; I < 6; ++I) G.D4[2 + I] = static_cast<std::uint8_t>(Read(25 + 2 * I, 2));
    return G;
  }
};

struct TTypeInfo;
using PTypeInfo = const TTypeInfo*;

//===----------------------------------------------------------------------===//
// The root interface
//===----------------------------------------------------------------------===//

/// Declares the identity, name and parent of an interface; put it first in the body.
#define FK_INTERFACE(Name, Parent, Guid)                                                           \
  using inherited = Parent;                                                                        \
  [[maybe_unused]] static constexpr ::formkit::TGUID IID = ::formkit::TGUID::Parse(Guid);          \
  [[maybe_unused]] static constexpr const char* InterfaceName = #Name;

/// The root of every interface: identity query and counting.
struct FK_API IInterface {
  using inherited = void;
  static constexpr TGUID IID = TGUID::Parse("{00000000-0000-0000-C000-000000000046}");
  static constexpr const char* InterfaceName = "IInterface";

  /// On success stores a counted pointer to the interface `IID` in `*Obj` and returns true;
  /// otherwise stores null and returns false.
  virtual bool QueryInterface(const TGUID& IID, void** Obj) = 0;
  /// Adds a reference; returns the new count (or -1 for objects that are not counted).
  virtual int AddRef() = 0;
  /// Drops a reference and frees the object when none is left.
  virtual int Release() = 0;

protected:
  ~IInterface() = default;
};

//===----------------------------------------------------------------------===//
// Counted pointer
//===----------------------------------------------------------------------===//

/// A counted reference to an interface (or a counted object): assigning, copying and
/// clearing keep the count.
template <class I> class IPtr {
public:
  IPtr() noexcept = default;
  IPtr(std::nullptr_t) noexcept {}
  /// Takes a new reference to `P`.
  IPtr(I* P) noexcept : FPtr(P) {
    if (FPtr) FPtr->AddRef();
  }
  IPtr(const IPtr& O) noexcept : IPtr(O.FPtr) {}
  IPtr(IPtr&& O) noexcept : FPtr(std::exchange(O.FPtr, nullptr)) {}
  /// Upcast along a version chain or class hierarchy.
  template <class J>
    requires std::is_convertible_v<J*, I*>
  IPtr(const IPtr<J>& O) noexcept : IPtr(static_cast<I*>(O.Get())) {}
  template <class J>
    requires std::is_convertible_v<J*, I*>
  IPtr(IPtr<J>&& O) noexcept : FPtr(static_cast<I*>(O.Detach())) {}
  ~IPtr() { Reset(); }

  IPtr& operator=(IPtr O) noexcept {
    std::swap(FPtr, O.FPtr);
    return *this;
  }

  /// Adopts a pointer that already carries one reference for us.
  static IPtr Adopt(I* P) noexcept {
    IPtr R;
    R.FPtr = P;
    return R;
  }
  /// Gives up the reference without releasing it.
  I* Detach() noexcept { return std::exchange(FPtr, nullptr); }
  void Reset() noexcept {
    if (I* P = std::exchange(FPtr, nullptr)) P->Release();
  }

  I* Get() const noexcept { return FPtr; }
  I* operator->() const noexcept { return FPtr; }
  I& operator*() const noexcept { return *FPtr; }
  explicit operator bool() const noexcept { return FPtr != nullptr; }
  friend bool operator==(const IPtr& A, const IPtr& B) noexcept { return A.FPtr == B.FPtr; }
  friend bool operator==(const IPtr& A, std::nullptr_t) noexcept { return A.FPtr == nullptr; }

private:
  I* FPtr = nullptr;
};

/// Queries `Intf` for `J`: a counted reference, or null.
template <class J, class I> IPtr<J> QueryAs(I* Intf) {
  void* Out = nullptr;
  if (Intf && Intf->QueryInterface(J::IID, &Out)) return IPtr<J>::Adopt(static_cast<J*>(Out));
  return nullptr;
}
template <class J, class I> IPtr<J> QueryAs(const IPtr<I>& Intf) { return QueryAs<J>(Intf.Get()); }

/// The message of `EIntfCastError`: a checked cast met an object without the interface.
FK_RESOURCESTRING(SInterfaceNotSupported, "Interface not supported");

namespace detail {
/// Raises `EIntfCastError` with `SInterfaceNotSupported`.
[[noreturn]] FK_API void RaiseIntfCastError();
} // namespace detail

/// The checked form of `QueryAs`: a counted reference to `J`, for which the count of the
/// object goes up by one. Raises `EIntfCastError` "Interface not supported" when `Intf`
/// does not answer to `J`, leaving the count as it was. Null passes through as null, as
/// a cast of nothing gives nothing: test for null first where it is an error.
template <class J, class I> [[nodiscard]] IPtr<J> CastAs(I* Intf) {
  if (!Intf) return nullptr;
  IPtr<J> Result = QueryAs<J>(Intf);
  if (!Result) detail::RaiseIntfCastError();
  return Result;
}
template <class J, class I> [[nodiscard]] IPtr<J> CastAs(const IPtr<I>& Intf) { return CastAs<J>(Intf.Get()); }

/// True with a counted reference in `Out`, or false with `Out` cleared.
template <class J, class I> bool Supports(const IPtr<I>& Intf, IPtr<J>& Out) {
  Out = QueryAs<J>(Intf.Get());
  return static_cast<bool>(Out);
}
template <class J, class I> bool Supports(const IPtr<I>& Intf) {
  return static_cast<bool>(QueryAs<J>(Intf.Get()));
}

/// The identity of an interface reference: its `IInterface`, compared by address.
template <class I> bool SameObject(I* A, I* B) {
  return QueryAs<IInterface>(A).Get() == QueryAs<IInterface>(B).Get();
}

namespace detail {
/// True when `IID` names `I` or an older member of its chain.
template <class I> constexpr bool ChainHas(const TGUID& IID) {
  if (I::IID == IID) return true;
  if constexpr (!std::is_void_v<typename I::inherited>) return ChainHas<typename I::inherited>(IID);
  return false;
}
/// The member of `I`'s chain with identity `IID`, as an untyped pointer; `Self` is `I*`.
template <class I> void* ChainCast(I* Self, const TGUID& IID) {
  if (I::IID == IID) return Self;
  if constexpr (!std::is_void_v<typename I::inherited>)
    return ChainCast<typename I::inherited>(Self, IID);
  return nullptr;
}
} // namespace detail

} // namespace formkit
