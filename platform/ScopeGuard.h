//===- platform/ScopeGuard.h - Undo on the way out ------------------------===//
//
// The one scope guard of the library: `Finally` runs its cleanup whenever the
// scope ends; `OnFailure` runs it only when the scope is left by an exception,
// for "undo what was done if the rest fails". Either can be dismissed once the
// work is committed. Cleanups must not throw: a step that may fail (it notifies
// listeners) goes through `RunIgnoringExceptions` on the way out of a failure.
//
// Example:
//   FAligning = true;
//   auto Done = Finally([this]() noexcept { FAligning = false; });
//   AlignControls();         // however this ends, the flag goes down again
//
//   List.push_back(Item);
//   auto Undo = OnFailure([&]() noexcept { List.pop_back(); });
//   Notify(Item);            // if this throws, the item leaves the list again
//
//===----------------------------------------------------------------------===//
#pragma once

#include <exception>
#include <type_traits>
#include <utility>

namespace formkit {

/// Runs `Fn` when the scope ends: always (`Always` true) or only on an exception.
template <class Fn, bool Always> class [[nodiscard]] TScopeGuard {
  static_assert(std::is_nothrow_invocable_v<Fn&>, "a cleanup must be noexcept");

public:
  explicit TScopeGuard(Fn F) noexcept(std::is_nothrow_move_constructible_v<Fn>)
      : FFn(std::move(F)), FExceptions(std::uncaught_exceptions()) {}
  TScopeGuard(TScopeGuard&& Other) noexcept(std::is_nothrow_move_constructible_v<Fn>)
      : FFn(std::move(Other.FFn)), FExceptions(Other.FExceptions), FActive(std::exchange(Other.FActive, false)) {}
  TScopeGuard(const TScopeGuard&) = delete;
  TScopeGuard& operator=(const TScopeGuard&) = delete;
  TScopeGuard& operator=(TScopeGuard&&) = delete;
  ~TScopeGuard() {
    if (FActive && (Always || std::uncaught_exceptions() > FExceptions)) FFn();
  }
  /// The work is committed: the cleanup will not run.
  void Dismiss() noexcept { FActive = false; }

private:
  Fn FFn;
  int FExceptions;
  bool FActive = true;
};

/// A guard that runs `F` whenever the scope ends.
template <class Fn> [[nodiscard]] auto Finally(Fn&& F) {
  return TScopeGuard<std::decay_t<Fn>, true>(std::forward<Fn>(F));
}

/// A guard that runs `F` only when the scope is left by an exception.
template <class Fn> [[nodiscard]] auto OnFailure(Fn&& F) {
  return TScopeGuard<std::decay_t<Fn>, false>(std::forward<Fn>(F));
}

/// Runs `F` and drops whatever it throws, for a step whose failure cannot be reported: in
/// a teardown, or in an `OnFailure` cleanup that notifies or lays out (ending an update,
/// a selection batch), where a second exception could only replace the first, the one
/// to report. For such a cleanup the scope dismisses the guard once the work succeeded
/// and takes the step itself, so that a failure there passes on.
///
/// Example:
///   Strings->BeginUpdate();
///   auto End = OnFailure([&]() noexcept { RunIgnoringExceptions([&] { Strings->EndUpdate(); }); });
///   Strings->Add(Line);
///   End.Dismiss();
///   Strings->EndUpdate();   // listeners hear here; what they throw passes on
template <class Fn> void RunIgnoringExceptions(Fn&& F) noexcept {
  try {
    std::forward<Fn>(F)();
  } catch (...) {
    // Dropped on purpose: see above.
  }
}

} // namespace formkit
