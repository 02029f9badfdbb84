//===- bench/family/FamilyBench.cpp - Names, renames and changes across a family ===//
//
// A Kiln module on design with 1,000 / 10,000 / 100,000 buttons named Button1..ButtonN.
// `BM_UniqueName` asks the module for a free name of the stem Button, which must
// try every taken number, against the plain walk of `FindComponent` over the
// same names; `BM_UniqueNameNewStem` asks 1,000 times for a stem nobody uses,
// against as many `FindComponent` of a made-up name. `BM_RenameThroughFamily` renames a component of a module
// that 5 / 50 open descendants inherit from (each a real module copied from its
// ancestor, through the test suite's generated classes and update managers),
// so that the rename runs down to every descendant, against a plain `SetName`
// of as many undesigned components. Each figure carries `x_base`, its time over
// the baseline measured in the same run; the free name grows about 10x from N
// to 10N (it tries N numbers), the new stem not at all, the rename about 10x
// from 5 to 50 descendants. `BM_AncestorChange` moves one button of an ancestor of
// 1,000 buttons and tells its module, which carries the change to 1 / 10 / 50 open
// descendants through the real update managers, against 50 direct writes of the same
// property; the time over the number of descendants is what each descendant adds.
//
// Example:
//   build/release/bench/family/fk_bench_family --benchmark_min_time=0.2
//
//===----------------------------------------------------------------------===//
#include "bench/BenchTiming.h"
#include "bench/KilnDesignRun.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "tests/fakes/RecordingModule.h"
#include "tests/frameworks/kiln/design/ClassFamily.h"

#include <benchmark/benchmark.h>

#include <functional>
#include <memory>

using namespace formkit;

namespace {

using bench::BestOf;
using bench::SecondsOf;

using bench::Run;

/// A module open for the length of a scope.
struct TOpenModule {
  IPtr<IRoot> Root;
  explicit TOpenModule(IPtr<IRoot> R) : Root(std::move(R)) {}
  TOpenModule(TOpenModule&&) = default;
  ~TOpenModule() {
    if (Root && Root->GetRoot()) Root->Close();
  }
  TComponentRoot* Kiln() const { return dynamic_cast<TComponentRoot*>(QueryAs<IInternalRoot>(Root)->Implementor()); }
};

TOpenModule NewModule(const String& Name, const String& AncestorName) {
  IPtr<fakes::TRecordingModule> Module = New<fakes::TRecordingModule>(Name + ".kfm", &Run().Log);
  return TOpenModule(Run().Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), Name + ".kfm", false, Name,
                                               AncestorName, "", nullptr, ""));
}

/// Runs `Step` each iteration (the host's log is emptied between steps, untimed) and
/// reports `x_base` against `BaseSeconds`.
void Report(benchmark::State& State, double BaseSeconds, const std::function<void()>& Step) {
  bench::ReportAgainstBase(State, BaseSeconds, Step, [] { Run().Log.Clear(); });
}

/// Module Form1 with `Count` buttons named Button1..ButtonCount.
TOpenModule ButtonModule(int Count) {
  TOpenModule Form = NewModule("Form1", "");
  auto* Root = static_cast<TWinControl*>(Form.Root->GetRoot());
  for (int I = 1; I <= Count; ++I) {
    auto* Button = CreateComponentOf<TButton>(Root);
    Button->SetName("Button" + IntToStr(I));
    Button->SetParent(Root);
  }
  Run().Log.Clear();
  return Form;
}

void BM_UniqueName(benchmark::State& State) {
  int Count = static_cast<int>(State.range(0));
  TOpenModule Form = ButtonModule(Count);
  TComponent* Root = Form.Root->GetRoot();
  int Free = 0;
  double Base = BestOf(5, [&] {
    Free = 1;
    while (Root->FindComponent("Button" + std::to_string(Free))) ++Free;
  });
  String Found;
  Report(State, Base, [&] { Found = Form.Kiln()->UniqueName("TButton"); });
  if (Found != "Button" + IntToStr(Count + 1) || Free != Count + 1) State.SkipWithError("wrong free name");
}

/// One call is shorter than the clock's own cost: both sides are timed 1,000 calls at once.
constexpr int NewStemCalls = 1000;

void BM_UniqueNameNewStem(benchmark::State& State) {
  TOpenModule Form = ButtonModule(static_cast<int>(State.range(0)));
  TComponent* Root = Form.Root->GetRoot();
  bool Taken = true;
  double Base = BestOf(5, [&] {
    for (int I = 0; I < NewStemCalls; ++I) Taken = Root->FindComponent("Label" + std::to_string(I % 2 + 1)) != nullptr;
  });
  String Found;
  Report(State, Base, [&] {
    for (int I = 0; I < NewStemCalls; ++I) Found = Form.Kiln()->UniqueName("TLabel");
  });
  if (Found != "Label1" || Taken) State.SkipWithError("wrong free name");
}

void BM_RenameThroughFamily(benchmark::State& State) {
  int Descendants = static_cast<int>(State.range(0));
  fakes::TInheritance Family(nullptr);
  TOpenModule Ancestor = NewModule("Form0", "");
  auto* Root = static_cast<TWinControl*>(Ancestor.Root->GetRoot());
  for (int I = 1; I <= 10; ++I) {
    auto* Button = CreateComponentOf<TButton>(Root);
    Button->SetName("Button" + IntToStr(I));
    Button->SetParent(Root);
  }
  std::vector<TOpenModule> Family1;
  for (int D = 1; D <= Descendants; ++D) Family1.push_back(NewModule("Form" + IntToStr(D), "Form0"));
  auto* Manager = fakes::TInheritance::FamilyOf(QueryAs<IInternalRoot>(Ancestor.Root)->GetUpdateManager());
  if (!Manager || Manager->DescendantCount() != Descendants) {
    State.SkipWithError("the descendants did not join the family");
    return;
  }
  // The baseline: as many plain components of undesigned forms, renamed directly.
  std::vector<TObjectGuard<TForm>> Plain;
  std::vector<TComponent*> PlainButtons;
  for (int D = 0; D <= Descendants; ++D) {
    Plain.emplace_back(CreateComponentOf<TForm>(nullptr));
    PlainButtons.push_back(CreateComponentOf<TButton>(Plain.back().Get()));
    PlainButtons.back()->SetName("Button1");
  }
  bool Flip = false;
  double Base = BestOf(5, [&] {
    Flip = !Flip;
    for (TComponent* B : PlainButtons) B->SetName(Flip ? "Renamed1" : "Button1");
  });
  Run().Log.Clear();
  Flip = false;
  Report(State, Base, [&] {
    Flip = !Flip;
    Ancestor.Kiln()->RenameComponent(Flip ? "Button1" : "Renamed1", Flip ? "Renamed1" : "Button1");
  });
  TComponent* Last = Family1.back().Root->GetRoot();
  if (!Last->FindComponent(Flip ? "Renamed1" : "Button1")) State.SkipWithError("the last descendant was not renamed");
}

constexpr int AncestorButtons = 1000;

void BM_AncestorChange(benchmark::State& State) {
  int Descendants = static_cast<int>(State.range(0));
  TOpenModule Ancestor = ButtonModule(AncestorButtons);
  std::vector<TOpenModule> Family;
  for (int D = 1; D <= Descendants; ++D) Family.push_back(NewModule("Heir" + IntToStr(D), "Form1"));
  auto* Moved = static_cast<TControl*>(Ancestor.Root->GetRoot()->FindComponent("Button500"));
  // The baseline: the same property written directly, 50 times.
  std::vector<TObjectGuard<TButton>> Plain;
  for (int I = 0; I < 50; ++I) Plain.emplace_back(CreateComponentOf<TButton>(nullptr));
  int Left = 100;
  double Base = BestOf(5, [&] {
    ++Left;
    for (auto& B : Plain) B->SetLeft(Left);
  });
  Report(State, Base, [&] {
    Moved->SetLeft(++Left);
    Ancestor.Kiln()->Modified();
  });
  auto* Heir = static_cast<TControl*>(Family.back().Root->GetRoot()->FindComponent("Button500"));
  if (!Heir || Heir->Left() != Left) State.SkipWithError("the change did not reach the last descendant");
}

void Sizes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n"});
  for (int N : {1000, 10000, 100000}) B->Args({N});
  B->Unit(benchmark::kMicrosecond)->UseManualTime();
}

void Families(benchmark::internal::Benchmark* B) {
  B->ArgNames({"descendants"});
  for (int N : {5, 50}) B->Args({N});
  B->Unit(benchmark::kMicrosecond)->UseManualTime();
}

BENCHMARK(BM_UniqueName)->Apply(Sizes);
BENCHMARK(BM_UniqueNameNewStem)->Apply(Sizes);
BENCHMARK(BM_RenameThroughFamily)->Apply(Families);
BENCHMARK(BM_AncestorChange)->ArgNames({"descendants"})->Arg(1)->Arg(10)->Arg(50)->Unit(benchmark::kMillisecond)->UseManualTime();

} // namespace

int main(int argc, char** argv) { return bench::RunWithKilnDesigner(argc, argv); }
