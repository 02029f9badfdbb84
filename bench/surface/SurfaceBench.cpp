//===- bench/surface/SurfaceBench.cpp - One step of a move drag ----------===//
//
// A move drag over a parent with 1,000 and 10,000 sibling items, all with
// guides (edges, margins, a baseline), on the headless test surface. One step
// is one `DragTo` that changes the feedback rectangle: snapping on both axes to
// margins, alignment guides and the grid, moving the box, and painting the
// guide lines. The baseline, measured in the same run, is a plain loop over the
// same sibling rectangles that finds the nearest left edge.
//
//   cmake --preset release -B build/release && cmake --build build/release --target fk_bench_surface
//   build/release/bench/surface/fk_bench_surface
//
//===----------------------------------------------------------------------===//
#include "tests/fakes/TestSurface.h"

#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A surface with `N` siblings at pseudo-random places at a constant density, and an
/// engine in the middle of a move drag of the first one.
struct TScene {
  explicit TScene(int N) {
    S = New<TTestSurface>();
    int Side = 1;
    while (Side * Side < N) ++Side;
    S->Root->Bounds = TRect{0, 0, Side * 60 + 100, Side * 40 + 100};
    std::uint32_t Seed = 12345;
    auto Next = [&](int Range) {
      Seed = Seed * 1664525u + 1013904223u;
      return static_cast<int>((Seed >> 8) % static_cast<std::uint32_t>(Range));
    };
    for (int I = 0; I < N; ++I) {
      TTestControl* C = S->AddControl(nullptr, "C" + std::to_string(I),
                                      Bounds(Next(Side * 60), Next(Side * 40), 30 + Next(40), 13 + Next(10)));
      C->Margins = TRect{3, 3, 3, 3};
      C->Baseline = 10;
      Rects.push_back(C->Bounds);
    }
    Dragged = S->Controls.front();
    D = New<TDesigner>(IPtr<IDesignSurface>(S), nullptr, nullptr);
    From = TPoint{Dragged->Bounds.Left + 2, Dragged->Bounds.Top + 2};
    S->Listener->MouseDown(S->ItemOf(Dragged), {}, From.X, From.Y, false, {}, false);
  }
  ~TScene() {
    S->Listener->CancelDragging();
    D->Close();
  }
  /// One step that changes the feedback: the deltas alternate between two places.
  void Step() {
    Flip = !Flip;
    S->Listener->MouseMove(From.X + (Flip ? 37 : 83), From.Y + (Flip ? 29 : 61));
  }
  IPtr<TTestSurface> S;
  IPtr<TDesigner> D;
  TTestControl* Dragged = nullptr;
  TPoint From;
  bool Flip = false;
  std::vector<TRect> Rects;
};

/// The plain loop: the sibling left edge nearest to `X`.
int NearestLeft(const std::vector<TRect>& Rects, int X) {
  int Best = INT32_MAX, Result = X;
  for (const TRect& R : Rects) {
    const int D = std::abs(R.Left - X);
    if (D < Best) {
      Best = D;
      Result = R.Left;
    }
  }
  return Result;
}

void BM_DragToStep(benchmark::State& State) {
  TScene Scene(static_cast<int>(State.range(0)));
  for (auto _ : State) Scene.Step();
  State.counters["siblings"] = static_cast<double>(State.range(0));
}
BENCHMARK(BM_DragToStep)->Arg(1000)->Arg(10000)->Unit(benchmark::kMicrosecond);

void BM_PlainLoop(benchmark::State& State) {
  TScene Scene(static_cast<int>(State.range(0)));
  int X = 0;
  for (auto _ : State) benchmark::DoNotOptimize(X = NearestLeft(Scene.Rects, X + 37));
}
BENCHMARK(BM_PlainLoop)->Arg(1000)->Arg(10000)->Unit(benchmark::kMicrosecond);

/// Microseconds per call of `F`, over enough calls to take about 0.3 s.
template <class F> double MicrosPer(F&& Fn) {
  using Clock = std::chrono::steady_clock;
  long Calls = 0;
  const auto Start = Clock::now();
  auto Now = Start;
  do {
    for (int I = 0; I < 64; ++I) Fn();
    Calls += 64;
    Now = Clock::now();
  } while (Now - Start < std::chrono::milliseconds(300));
  return std::chrono::duration<double, std::micro>(Now - Start).count() / static_cast<double>(Calls);
}

void Summary() {
  double Step[2], Loop[2];
  size_t Guides[2];
  const int Sizes[2] = {1000, 10000};
  for (int I = 0; I < 2; ++I) {
    TScene Scene(Sizes[I]);
    Guides[I] = Scene.D->HorzGuides().size() + Scene.D->VertGuides().size();
    Step[I] = MicrosPer([&] { Scene.Step(); });
    int X = 0;
    Loop[I] = MicrosPer([&] { benchmark::DoNotOptimize(X = NearestLeft(Scene.Rects, X + 37)); });
  }
  std::printf("\nOne DragTo step of a move drag (microseconds)\n");
  std::printf("%10s %10s %12s %12s %10s\n", "siblings", "guides", "DragTo", "plain loop", "ratio");
  for (int I = 0; I < 2; ++I)
    std::printf("%10d %10zu %12.2f %12.2f %10.2f\n", Sizes[I], Guides[I], Step[I], Loop[I], Step[I] / Loop[I]);
  std::printf("growth from 1,000 to 10,000: DragTo x%.2f, plain loop x%.2f\n", Step[1] / Step[0],
              Loop[1] / Loop[0]);
}

} // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  Summary();
  return 0;
}
