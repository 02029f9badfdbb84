//===- bench/BenchTiming.h - Timing a step and its baseline ---------------===//
//
// The two clocks every benchmark of the project reads: the time of one step, and
// the best of a few runs of a baseline measured in the same run, so that a figure
// can be reported as a ratio (`x_base`) rather than as time on a shared machine.
//
// Example:
//   double Base = bench::BestOf(5, [&] { for (auto* B : Buttons) B->SetLeft(1); });
//   double Mine = bench::SecondsOf([&] { Left->SetValue("1"); });
//   State.counters["x_base"] = Mine / Base;
//
//===----------------------------------------------------------------------===//
#pragma once

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <functional>

namespace formkit::bench {

/// The seconds `Step` takes.
inline double SecondsOf(const std::function<void()>& Step) {
  auto T0 = std::chrono::steady_clock::now();
  Step();
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - T0).count();
}

/// The best of `Reps` runs of `Step`: the baseline's noise floor.
inline double BestOf(int Reps, const std::function<void()>& Step) {
  double Best = 1e9;
  for (int I = 0; I < Reps; ++I) Best = std::min(Best, SecondsOf(Step));
  return Best;
}

/// Times `Step` at each iteration as the iteration's manual time and reports `x_base`:
/// the mean time over `BaseSeconds`. `BetweenSteps`, if given, runs after each step,
/// untimed.
inline void ReportAgainstBase(benchmark::State& State, double BaseSeconds, const std::function<void()>& Step,
                              const std::function<void()>& BetweenSteps = {}) {
  double Total = 0;
  for (auto _ : State) {
    double Seconds = SecondsOf(Step);
    State.SetIterationTime(Seconds);
    Total += Seconds;
    if (BetweenSteps) BetweenSteps();
  }
  State.counters["x_base"] = Total / static_cast<double>(State.iterations()) / BaseSeconds;
}

} // namespace formkit::bench
