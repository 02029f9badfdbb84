//===- platform/Sets.h - Sets of enumeration values ----------------------===//
//
// `TSet<E>`: a set of up to 64 values of a contiguous enumeration, as a bit mask;
// `TSet<E, std::uint16_t>` packs a small one into 16 bits where a stored form needs it.
//
// Example:
//   TSet<TAnchorKind> Anchors{akLeft, akTop};
//   if (Anchors.Contains(akLeft)) ...
//
//===----------------------------------------------------------------------===//
#pragma once

#include <cstdint>
#include <initializer_list>

namespace formkit {

/// A set of enumeration values held as a bit mask of `Storage`; element `V` is bit `V`.
template <class E, class Storage = std::uint64_t> class TSet {
public:
  constexpr TSet() noexcept = default;
  constexpr TSet(std::initializer_list<E> Values) noexcept {
    for (E V : Values) Include(V);
  }
  static constexpr TSet FromMask(Storage Mask) noexcept {
    TSet S;
    S.FMask = Mask;
    return S;
  }

  constexpr bool Contains(E V) const noexcept { return (FMask >> Bit(V)) & 1u; }
  constexpr TSet& Include(E V) noexcept {
    FMask = static_cast<Storage>(FMask | (Storage(1) << Bit(V)));
    return *this;
  }
  constexpr TSet& Exclude(E V) noexcept {
    FMask = static_cast<Storage>(FMask & ~(Storage(1) << Bit(V)));
    return *this;
  }
  constexpr bool Empty() const noexcept { return FMask == 0; }
  constexpr Storage Mask() const noexcept { return FMask; }

  friend constexpr TSet operator+(TSet A, TSet B) noexcept { return FromMask(static_cast<Storage>(A.FMask | B.FMask)); }
  friend constexpr TSet operator-(TSet A, TSet B) noexcept { return FromMask(static_cast<Storage>(A.FMask & ~B.FMask)); }
  friend constexpr TSet operator*(TSet A, TSet B) noexcept { return FromMask(static_cast<Storage>(A.FMask & B.FMask)); }
  friend constexpr bool operator==(TSet A, TSet B) noexcept { return A.FMask == B.FMask; }
  /// True when every element of `A` is in `B`.
  friend constexpr bool operator<=(TSet A, TSet B) noexcept { return (A.FMask & ~B.FMask) == 0; }

private:
  static constexpr unsigned Bit(E V) noexcept { return static_cast<unsigned>(V) % (8 * sizeof(Storage)); }
  Storage FMask = 0;
};

} // namespace formkit
