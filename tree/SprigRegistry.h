//===- tree/SprigRegistry.h - Which sprig class shows which object -------===//
//
// Framework packages register sprig classes for object classes or for sets of
// interfaces; the registry answers with the closest registration. Interface
// registrations win outright, newest first; among class registrations the one
// fewest generations above the object's class wins, the newer on a tie. One
// answer is remembered. A package's registrations go with its group. Two
// registries work alike: one for sprigs, one for root sprigs.
//
// Example:
//   RegisterSprigType(TButton::StaticClass(), TButtonSprig::StaticClass());
//   FindBestSprigClass(TButton::StaticClass(), TComponentSprig::StaticClass());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tree/TreeIntf.h"

namespace formkit {

/// A list of interface identities.
using TGUIDArray = std::vector<TGUID>;

/// A registration by class.
struct TSprigType {
  /// The package group current at registration.
  int Group = 0;
  TClass Class = nullptr;
  TSprigClass SprigClass = nullptr;
  /// How many generations `AClass` stands below `Class`; the largest int when it does not
  /// descend from it.
  int Score(TClass AClass) const noexcept;
};

/// A registration by interfaces.
struct TSprigIntfType {
  int Group = 0;
  TGUIDArray Interfaces;
  TSprigClass SprigClass = nullptr;
  /// True when `AClass` implements every interface; an empty list matches every class.
  bool Match(TClass AClass) const;
};

/// One registry: registrations newest first, and the last answer.
class FK_API TSprigTypeList : public TObject {
  FK_CLASS(TSprigTypeList, TObject)
  TSprigTypeList() = default;

  void Add(TClass AClass, TSprigClass ASprigClass);
  void Add(const TGUIDArray& AInterfaces, TSprigClass ASprigClass);
  void ClearCache() noexcept;
  TSprigClass Match(TClass AClass);
  TSprigClass MatchCache(TClass AClass) const noexcept;
  TSprigClass MatchClass(TClass AClass);
  /// Drops the registrations of `AGroup` and the remembered answer.
  void FreeEditorGroup(int AGroup);
  int Count() const noexcept { return static_cast<int>(FList.size() + FInterfaceList.size()); }

private:
  std::vector<TSprigType> FList; // newest first
  TClass FLastClass = nullptr;
  TSprigClass FLastSprigClass = nullptr;
  std::vector<TSprigIntfType> FInterfaceList; // newest first
};

FK_API void RegisterSprigType(TClass AClass, TSprigClass ASprigClass);
FK_API void RegisterSprigType(const TGUIDArray& AInterfaces, TSprigClass ASprigClass);
/// The closest sprig class for objects of `AClass`, if it descends from `TSprig`.
FK_API TSprigClass FindBestSprigClass(TClass AClass);
/// The closest sprig class, refused (null) unless it descends from `AMinimumSprigClass`;
/// the next best is not tried.
FK_API TSprigClass FindBestSprigClass(TClass AClass, TSprigClass AMinimumSprigClass);
FK_API void RegisterRootSprigType(TClass AClass, TSprigClass ASprigClass);
FK_API void RegisterRootSprigType(const TGUIDArray& AInterfaces, TSprigClass ASprigClass);
FK_API TRootSprigClass FindBestRootSprigClass(TClass AClass);
FK_API TRootSprigClass FindBestRootSprigClass(TClass AClass, TSprigClass AMinimumSprigClass);

/// The two registries; null before their first registration.
FK_API TSprigTypeList* SprigRegistry() noexcept;
FK_API TSprigTypeList* RootSprigRegistry() noexcept;

namespace detail {
/// The start and stop steps of the registries and the default registrations.
void StartSprigRegistries();
void StopSprigRegistries() noexcept;
void RegisterDefaultSprigs();
} // namespace detail

} // namespace formkit
