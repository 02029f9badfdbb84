//===- bench/positioning/PositioningBench.cpp - Lining up and sleeping modules ===//
//
// A Kiln form on design with 1,000 / 10,000 / 100,000 buttons side by side on the
// form, all selected. `BM_AlignLeft` lines them up on the first one's left edge and
// `BM_SpaceEqually` spaces them evenly between the outer two, each through the root's
// positioning command (one parent, every item through its bounds, one `Modified`),
// against writing the same bounds directly to the buttons. Between steps the buttons
// go back to their scattered places, untimed. `BM_SleepAndWake` sends the module
// dormant and brings it back from its stream, against a plain save of the module to its
// file and an open of that file through the designer. Each figure carries `x_base`,
// its time over the baseline measured in the same run; all three grow linearly.
//
// Example:
//   build/release/bench/positioning/fk_bench_positioning --benchmark_min_time=0.2
//
//===----------------------------------------------------------------------===//
#include "bench/BenchTiming.h"
#include "bench/KilnDesignRun.h"
#include "core/DesignIntfClasses.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "tests/fakes/RecordingModule.h"

#include <benchmark/benchmark.h>

#include <filesystem>
#include <functional>

using namespace formkit;

namespace {

using bench::BestOf;
using bench::Run;

/// A form module with `Count` buttons in a row, open for the length of a scope.
struct TButtonForm {
  IPtr<IRoot> Root;
  std::vector<TButton*> Buttons;
  std::filesystem::path File;

  explicit TButtonForm(int Count) {
    File = std::filesystem::temp_directory_path() / ("fk-bench-positioning-" + std::to_string(::getpid()) + ".kfm");
    Root = Open(false);
    auto* Form = static_cast<TWinControl*>(Root->GetRoot());
    Buttons.reserve(static_cast<std::size_t>(Count));
    for (int I = 1; I <= Count; ++I) {
      auto* Button = CreateComponentOf<TButton>(Form);
      Button->SetName("Button" + IntToStr(I));
      Button->SetParent(Form);
      Buttons.push_back(Button);
    }
    Scatter();
    Run().Log.Clear();
  }
  ~TButtonForm() {
    if (Root && (Root->GetRoot() || QueryAs<IInternalRoot>(Root)->IsDormant())) Root->Close();
    std::error_code Ignored;
    std::filesystem::remove(File, Ignored);
    std::filesystem::remove(std::filesystem::path(File).replace_extension(".~kfm"), Ignored);
  }
  TButtonForm(const TButtonForm&) = delete;
  TButtonForm& operator=(const TButtonForm&) = delete;

  IPtr<IRoot> Open(bool Existing) {
    IPtr<fakes::TRecordingModule> Module = New<fakes::TRecordingModule>(File.string(), &Run().Log);
    return Run().Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), File.string(), Existing,
                                      Existing ? "" : "Form1", "", "", nullptr, "");
  }
  TComponentRoot* Kiln() const { return dynamic_cast<TComponentRoot*>(QueryAs<IInternalRoot>(Root)->Implementor()); }
  /// Each button at its own place in a row.
  void Scatter() {
    for (std::size_t I = 0; I < Buttons.size(); ++I)
      Buttons[I]->SetBounds(static_cast<int>(I % 1000) * 7 + 8, static_cast<int>(I / 1000) * 30 + 8, 75, 25);
  }
  void SelectAll() {
    IPtr<IDesignerSelections> All = CreateSelectionList();
    for (TButton* B : Buttons) All->Add(B);
    Kiln()->SetSelections(All);
  }
};

/// Lines up or spaces the whole selection with `Affect`; the baseline writes the bounds
/// the command gives each button (taken from one untimed run) directly.
void AlignAgainstDirectWrites(benchmark::State& State, TOTAAffect Affect) {
  TButtonForm Form(static_cast<int>(State.range(0)));
  Form.SelectAll();
  if (Form.Kiln()->GetSelection()->GetCount() != static_cast<int>(Form.Buttons.size())) {
    State.SkipWithError("the buttons were not all selected");
    return;
  }
  Form.Kiln()->Align(Affect);
  std::vector<TRect> Target;
  for (TButton* B : Form.Buttons) Target.push_back(B->BoundsRect());
  Form.Scatter();
  double Scatter = BestOf(5, [&] { Form.Scatter(); });
  double Base = BestOf(5, [&] {
    for (std::size_t I = 0; I < Target.size(); ++I) Form.Buttons[I]->SetBoundsRect(Target[I]);
    Form.Scatter();
  });
  bench::ReportAgainstBase(State, std::max(Base - Scatter, 1e-9), [&] { Form.Kiln()->Align(Affect); },
                           [&] {
                             Form.Scatter();
                             Run().Log.Clear();
                           });
  Form.Kiln()->Align(Affect);
  for (std::size_t I = 0; I < Target.size(); ++I)
    if (Form.Buttons[I]->BoundsRect() != Target[I]) {
      State.SkipWithError("the command placed the buttons differently from one run to the next");
      return;
    }
}

void BM_AlignLeft(benchmark::State& State) { AlignAgainstDirectWrites(State, afLeft); }

void BM_SpaceEqually(benchmark::State& State) { AlignAgainstDirectWrites(State, afHSpace); }

void BM_SleepAndWake(benchmark::State& State) {
  TButtonForm Form(static_cast<int>(State.range(0)));
  auto Internal = QueryAs<IInternalRoot>(Form.Root);
  double Base = BestOf(3, [&] {
    Form.Root->Save();
    IPtr<IRoot> Copy = Form.Open(true);
    Copy->Close();
  });
  bench::ReportAgainstBase(State, Base, [&] {
    Form.Root->GoDormant();
    Internal->Resurrect();
  });
  if (!Form.Root->GetRoot() || Form.Root->GetRoot()->ComponentCount() != static_cast<int>(Form.Buttons.size()))
    State.SkipWithError("the module did not come back whole");
  Form.Buttons.clear();
}

void Sizes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n"});
  for (int N : {1000, 10000, 100000}) B->Args({N});
  B->Unit(benchmark::kMillisecond)->UseManualTime();
}

BENCHMARK(BM_AlignLeft)->Apply(Sizes);
BENCHMARK(BM_SpaceEqually)->Apply(Sizes);
BENCHMARK(BM_SleepAndWake)->Apply(Sizes);

} // namespace

int main(int argc, char** argv) { return bench::RunWithKilnDesigner(argc, argv); }
