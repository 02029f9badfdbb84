//===- tests/platform/GuardsTest.cpp - Scope guards and object guards -----===//
#include "platform/TypInfo.h"

#include <gtest/gtest.h>

#include <stdexcept>

using namespace formkit;

namespace {

/// Counts its instances, so that a test sees what was freed.
class TCounted : public TInterfacedObject {
  FK_CLASS(TCounted, TInterfacedObject)
  TCounted() { ++Alive; }
  ~TCounted() override { --Alive; }
  static inline int Alive = 0;
  static inline bool FailAfterConstruction = false;
  void AfterConstruction() override {
    if (FailAfterConstruction) throw std::runtime_error("refused");
  }
};
FK_IMPLEMENT(TCounted, "GuardsTest") {}

} // namespace

TEST(ScopeGuards, FinallyAlwaysRunsOnFailureOnlyOnAnExceptionAndADismissedGuardNever) {
  std::vector<String> Log;
  {
    auto A = Finally([&]() noexcept { Log.push_back("finally"); });
    auto B = OnFailure([&]() noexcept { Log.push_back("failure"); });
  }
  EXPECT_EQ(std::vector<String>{"finally"}, Log);
  Log.clear();
  try {
    auto A = Finally([&]() noexcept { Log.push_back("finally"); });
    auto B = OnFailure([&]() noexcept { Log.push_back("failure"); });
    auto C = OnFailure([&]() noexcept { Log.push_back("dismissed"); });
    C.Dismiss();
    throw std::runtime_error("stop");
  } catch (const std::runtime_error&) {
  }
  // The later guard runs first.
  EXPECT_EQ((std::vector<String>{"failure", "finally"}), Log);
  // A guard moved out of its scope runs once, where it ends up.
  Log.clear();
  {
    auto Outer = [&] { return Finally([&]() noexcept { Log.push_back("moved"); }); }();
    EXPECT_TRUE(Log.empty());
  }
  EXPECT_EQ(std::vector<String>{"moved"}, Log);
  // A cleanup that may raise is run quietly on the way out of a failure.
  RunIgnoringExceptions([] { throw std::runtime_error("dropped"); });
}

TEST(ObjectGuards, MoveResetAndReleaseFreeEachObjectOnce) {
  int Before = TCounted::Alive;
  {
    TObjectGuard<TCounted> A(new TCounted);
    TObjectGuard<TCounted> B(std::move(A));
    EXPECT_EQ(nullptr, A.Get());
    A = std::move(B); // back again; nothing freed on the way
    EXPECT_EQ(Before + 1, TCounted::Alive);
    A.Reset(new TCounted); // the first is freed
    EXPECT_EQ(Before + 1, TCounted::Alive);
    TCounted* Kept = A.Release();
    EXPECT_EQ(nullptr, A.Get());
    Kept->Destroy();
  }
  EXPECT_EQ(Before, TCounted::Alive);
}

TEST(ObjectGuards, ACountedObjectWhoseConstructionFailsLeavesNothing) {
  int Before = TCounted::Alive;
  TCounted::FailAfterConstruction = true;
  EXPECT_THROW(New<TCounted>(), std::runtime_error);
  TCounted::FailAfterConstruction = false;
  EXPECT_EQ(Before, TCounted::Alive);
  EXPECT_NE(nullptr, New<TCounted>().Get());
  EXPECT_EQ(Before, TCounted::Alive);
}
