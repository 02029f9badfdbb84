//===- bench/tree/TreeBench.cpp - The structure tree of a large module ------===//
//
// A Kiln form on design with 1,000 / 10,000 / 100,000 components nested five
// deep (a panel on the form holding a panel holding a panel holding a panel
// holding a button, again and again), its structure tree kept by the tree's own
// listener of the designer's notifications, as in an IDE.
//
// `BM_BuildTree` builds the tree of the module from nothing (a new root sprig of
// the class the registry gives the form, refreshed), against the baseline: a
// plain walk of the same components through `GetChildren`, measured in the same
// run. The ratio should stay the same from N to 10N (linear), and below 5.
// `BM_RenameOne`, `BM_InsertOne` and `BM_DeleteOne` carry one change into the
// tree: the notifications the designer sends its listeners (a rename is a change
// of the module, an insertion the new component's insertion and a change, a
// deletion the component's removal and a change) and the tree's next read
// (`Repopulate`, what the host's view asks for). The designer's own work on a
// change (its surface, its descendants) is not the tree's and is left out. Their
// time should not grow with N; their `x_base` is against the walk of the whole
// module, so it falls about 10x from N to 10N.
//
// Example:
//   build/release/bench/tree/fk_bench_tree --benchmark_min_time=0.2
//
//===----------------------------------------------------------------------===//
#include "bench/BenchTiming.h"
#include "bench/KilnDesignRun.h"
#include "core/DesignNotifications.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "tests/fakes/RecordingModule.h"
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

#include <benchmark/benchmark.h>

#include <functional>

using namespace formkit;

namespace {

using bench::BestOf;
using bench::Run;

/// Controls in one nest: four panels, one in the other, and a button in the last.
constexpr int NestDepth = 5;

/// A module open for the length of a scope, with its designer and its tree.
struct TTreeModule {
  IPtr<IRoot> Root;
  IPtr<IDesigner> Designer;
  TRootSprig* Tree = nullptr;
  /// The innermost panel of each nest, where insertions go.
  std::vector<TPanel*> Innermost;

  explicit TTreeModule(int Count) {
    IPtr<fakes::TRecordingModule> Module = New<fakes::TRecordingModule>("Form1.kfm", &Run().Log);
    Root = Run().Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Form1.kfm", false, "Form1", "",
                                      "", nullptr, "");
    Designer = QueryAs<IDesigner>(Root);
    auto* Form = static_cast<TWinControl*>(Root->GetRoot());
    int Made = 0;
    while (Made < Count) {
      TWinControl* Parent = Form;
      for (int Level = 1; Level < NestDepth && Made < Count; ++Level, ++Made) {
        auto* Panel = CreateComponentOf<TPanel>(Form);
        Panel->ChangeName("Panel" + IntToStr(Made + 1));
        Panel->SetParent(Parent);
        Parent = Panel;
      }
      if (Made >= Count) break;
      auto* Button = CreateComponentOf<TButton>(Form);
      Button->ChangeName("Button" + IntToStr(++Made));
      Button->SetParent(Parent);
      Innermost.push_back(static_cast<TPanel*>(Parent));
    }
    // The components were made past the designer: the tree learns them by a full read.
    RootSprigList()->FindRoot(Designer, Tree);
    Tree->ItemInserted();
    Tree->RefreshTreeView();
    Run().Log.Clear();
  }
  ~TTreeModule() {
    if (Root && Root->GetRoot()) Root->Close();
  }
  TTreeModule(const TTreeModule&) = delete;
  TTreeModule& operator=(const TTreeModule&) = delete;

  /// The baseline: every component of the module reached through `GetChildren`.
  int Walk() const {
    TComponent* Form = Root->GetRoot();
    int Seen = 0;
    std::function<void(TComponent*)> Visit = [&](TComponent* C) {
      ++Seen;
      C->GetChildren([&](TComponent* Child) { Visit(Child); }, Form);
    };
    Visit(Form);
    return Seen - 1;
  }
  double WalkSeconds() const {
    return BestOf(5, [this] { benchmark::DoNotOptimize(Walk()); });
  }
  /// A new button, the `Serial`th, in one of the nests; made past the designer and not
  /// yet told.
  TButton* NewButton(int Serial) {
    auto* Button = CreateComponentOf<TButton>(Root->GetRoot());
    Button->ChangeName("Extra" + IntToStr(Serial));
    Button->SetParent(Innermost[static_cast<std::size_t>(Serial) % Innermost.size()]);
    return Button;
  }
};

/// Counts the sprigs of a tree, the root left out.
int SprigCount(TSprig* S) {
  int N = 0;
  for (int I = 0; I < S->Count(); ++I) N += 1 + SprigCount(S->Items(I));
  return N;
}

void Report(benchmark::State& State, double BaseSeconds, const std::function<void()>& Step,
            const std::function<void()>& Between = {}) {
  bench::ReportAgainstBase(State, BaseSeconds, Step, [&] {
    if (Between) Between();
    Run().Log.Clear();
  });
}

void BM_BuildTree(benchmark::State& State) {
  TTreeModule Module(static_cast<int>(State.range(0)));
  double Base = Module.WalkSeconds();
  TClass RootClass = FindBestRootSprigClass(Module.Root->GetRoot()->ClassType());
  TObjectGuard<TSprig> Built;
  int Sprigs = 0;
  Report(
      State, Base,
      [&] {
        Built = NewSprig(RootClass, Module.Root->GetRoot());
        auto* Tree = static_cast<TRootSprig*>(Built.Get());
        Tree->SetDesigner(Module.Designer);
        Tree->RefreshTreeView();
      },
      [&] {
        Sprigs = SprigCount(Built.Get());
        Built.Reset();
      });
  if (Sprigs != Module.Walk()) State.SkipWithError("the tree does not show every component");
}

void BM_RenameOne(benchmark::State& State) {
  TTreeModule Module(static_cast<int>(State.range(0)));
  double Base = Module.WalkSeconds();
  TComponent* Deep = Module.Innermost.back()->Controls(0);
  TSprig* Sprig = Module.Tree->Find(Deep);
  int Serial = 0;
  Report(State, Base, [&] {
    Deep->ChangeName("Renamed" + IntToStr(++Serial));
    DesignNotificationItemsModified(Module.Designer);
    Module.Tree->Repopulate();
  });
  if (Module.Tree->Find(Deep) != Sprig || Sprig->Caption() != Deep->Name())
    State.SkipWithError("the rename did not reach the tree");
}

void BM_InsertOne(benchmark::State& State) {
  TTreeModule Module(static_cast<int>(State.range(0)));
  double Base = Module.WalkSeconds();
  int Serial = 0;
  TButton* Button = Module.NewButton(++Serial);
  Report(
      State, Base,
      [&] {
        DesignNotificationItemInserted(Module.Designer, Button);
        DesignNotificationItemsModified(Module.Designer);
        Module.Tree->Repopulate();
      },
      [&] {
        TSprig* Sprig = Module.Tree->Find(Button);
        if (!Sprig || Sprig->Parent()->Item() != Button->Parent()) State.SkipWithError("the insertion missed");
        Button = Module.NewButton(++Serial);
      });
}

void BM_DeleteOne(benchmark::State& State) {
  TTreeModule Module(static_cast<int>(State.range(0)));
  double Base = Module.WalkSeconds();
  int Serial = 0;
  auto Prepare = [&] {
    TButton* Button = Module.NewButton(++Serial);
    DesignNotificationItemInserted(Module.Designer, Button);
    Module.Tree->Repopulate();
    return Button;
  };
  TButton* Button = Prepare();
  // The component itself goes after the step: its owner tells each of its components,
  // which is the component framework's work, not the tree's.
  Report(
      State, Base,
      [&] {
        DesignNotificationItemDeleted(Module.Designer, Button);
        DesignNotificationItemsModified(Module.Designer);
        Module.Tree->Repopulate();
      },
      [&] {
        if (Module.Tree->Find(Button)) State.SkipWithError("the deletion missed");
        Button->Destroy();
        Button = Prepare();
      });
}

void Sizes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n"});
  for (int N : {1000, 10000, 100000}) B->Args({N});
  B->Unit(benchmark::kMicrosecond)->UseManualTime();
}

BENCHMARK(BM_BuildTree)->Apply(Sizes);
BENCHMARK(BM_RenameOne)->Apply(Sizes);
BENCHMARK(BM_InsertOne)->Apply(Sizes);
// A deleted component goes between two steps, and its owner tells every component it
// owns: a fixed count of steps keeps that untimed work bounded.
BENCHMARK(BM_DeleteOne)->Apply(Sizes)->Iterations(500);

} // namespace

int main(int argc, char** argv) {
  // The tree joins the core before it starts and then follows every designer.
  InitializeStructureTree();
  bench::CurrentRun() = std::make_unique<bench::TKilnDesignRun>();
  InitDesignNotification();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  bench::CurrentRun().reset();
  return 0;
}
