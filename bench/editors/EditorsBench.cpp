//===- bench/editors/EditorsBench.cpp - The inspector on many selected buttons ===//
//
// A selection of 100 / 1,000 / 10,000 / 100,000 Kiln buttons on one form. Listing measures
// `GetComponentProperties` over the whole selection against as many plain walks of
// the buttons' property lists; writing measures one `SetValue` of "Left" through the
// listed editor against as many direct calls of the buttons' setter. Each figure
// carries `x_base`, its time over the baseline measured in the same run; from N to
// 10N the times should grow about 10x.
//
// Example:
//   build/release/bench/editors/fk_bench_editors --benchmark_min_time=0.2
//
//===----------------------------------------------------------------------===//
#include "bench/BenchTiming.h"
#include "core/DesignCore.h"
#include "editors/DesignEditors.h"
#include "frameworks/kiln/Kiln.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <functional>

using namespace formkit;

namespace {

using bench::BestOf;
using bench::SecondsOf;

/// A form with `Count` buttons on it, and the selection of all of them.
struct TButtonForm {
  TObjectGuard<TForm> Form{CreateComponentOf<TForm>(nullptr)};
  std::vector<TButton*> Buttons;
  IPtr<IDesignerSelections> Selection = CreateSelectionList();

  explicit TButtonForm(int Count) {
    Form->SetName("Form1");
    for (int I = 0; I < Count; ++I) {
      auto* B = CreateComponentOf<TButton>(Form.Get());
      B->SetName("Button" + IntToStr(I));
      B->SetParent(Form.Get());
      B->SetBounds(I % 640, I / 640, 75, 25);
      Buttons.push_back(B);
      Selection->Add(B);
    }
  }
};

/// Reports `x_base` and the objects handled per second.
void Report(benchmark::State& State, double BaseSeconds, const std::function<void()>& Step) {
  bench::ReportAgainstBase(State, BaseSeconds, Step);
  State.SetItemsProcessed(State.iterations() * State.range(0));
}

void BM_ListCommonProperties(benchmark::State& State) {
  TButtonForm F(static_cast<int>(State.range(0)));
  size_t Walked = 0;
  double Base = BestOf(5, [&] {
    std::vector<PPropInfo> List;
    for (TButton* B : F.Buttons) {
      List.clear();
      GetPropList(B->ClassType()->TypeInfo(), tkAny, &List, true);
      Walked += List.size();
    }
  });
  size_t Listed = 0;
  Report(State, Base, [&] {
    GetComponentProperties(F.Selection, tkAny, nullptr, [&](const IPtr<IProperty>&) { ++Listed; });
  });
  benchmark::DoNotOptimize(Walked + Listed);
}

void BM_WriteToAll(benchmark::State& State) {
  TButtonForm F(static_cast<int>(State.range(0)));
  IPtr<IProperty> Left;
  GetComponentProperties(F.Selection, tkAny, nullptr, [&](const IPtr<IProperty>& P) {
    if (P->GetName() == "Left") Left = P;
  });
  int Next = 10;
  double Base = BestOf(5, [&] {
    ++Next;
    for (TButton* B : F.Buttons) B->SetLeft(Next);
  });
  Report(State, Base, [&] { Left->SetValue(IntToStr(++Next)); });
}

void Sizes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n"});
  for (int N : {100, 1000, 10000, 100000}) B->Args({N});
  B->Unit(benchmark::kMicrosecond)->UseManualTime();
}

BENCHMARK(BM_ListCommonProperties)->Apply(Sizes);
BENCHMARK(BM_WriteToAll)->Apply(Sizes);

} // namespace

int main(int argc, char** argv) {
  InitializeKiln();
  InitializeDesignEditors();
  StartDesignCore();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  StopDesignCore();
  FinalizeKiln();
  return 0;
}
