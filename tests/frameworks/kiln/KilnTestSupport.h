//===- tests/frameworks/kiln/KilnTestSupport.h - Shared test helpers -----===//
#pragma once

#include "frameworks/kiln/Kiln.h"
#include "platform/Filer.h"

#include <gtest/gtest.h>

namespace formkit::kilntest {

/// Starts the framework for a test and stops it afterwards.
class KilnTest : public ::testing::Test {
protected:
  void SetUp() override { InitializeKiln(); }
  void TearDown() override {
    ProcessMessages();
    FinalizeKiln();
  }
};

/// Destroys a root at the end of a scope.
template <class T> struct TRootGuard {
  T* P;
  explicit TRootGuard(T* Root) : P(Root) {}
  ~TRootGuard() {
    if (P) P->Destroy();
  }
  T* operator->() const { return P; }
  TRootGuard(const TRootGuard&) = delete;
  TRootGuard& operator=(const TRootGuard&) = delete;
};

/// Makes a component of `T` owned by `Owner`, named `Name`, parented to `Parent`.
template <class T> T* Make(TComponent* Owner, TWinControl* Parent, const String& Name) {
  T* C = CreateComponentOf<T>(Owner);
  C->SetName(Name);
  if constexpr (std::is_base_of_v<TControl, T>) C->SetParent(Parent);
  return C;
}

} // namespace formkit::kilntest
