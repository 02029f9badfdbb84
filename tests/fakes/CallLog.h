//===- tests/fakes/CallLog.h - What a fake was asked, in order -----------===//
#pragma once

#include "platform/System.h"

#include <vector>

namespace formkit::fakes {

/// The calls a fake received, one line each ("Name" or "Name(args)"), shared between
/// fakes so a test can assert the order across them.
struct TCallLog {
  std::vector<String> Calls;
  void Add(String Call) { Calls.push_back(std::move(Call)); }
  void Clear() { Calls.clear(); }
  /// How many calls start with `Prefix`.
  int Count(std::string_view Prefix) const {
    int N = 0;
    for (const String& C : Calls)
      if (C.compare(0, Prefix.size(), Prefix) == 0) ++N;
    return N;
  }
  /// Every call, one a line: for a failure's message.
  String Text() const {
    String All;
    for (const String& C : Calls) All += C + "\n";
    return All;
  }
};

} // namespace formkit::fakes
