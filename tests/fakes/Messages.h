//===- tests/fakes/Messages.h - The message of what a call raises --------===//
#pragma once

#include "platform/System.h"

namespace formkit::fakes {

/// The message of the `E` that `Call` raises, or "<no exception>"; another exception
/// passes on, so the test fails with it.
template <class E, class F> String MessageOf(F&& Call) {
  try {
    Call();
  } catch (const E& Error) {
    return Error.Message();
  }
  return "<no exception>";
}

} // namespace formkit::fakes
