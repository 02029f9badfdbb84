//===- bench/kiln/KilnFormsBench.cpp - Real forms: load, save, free -------===//
//
// Kiln forms of buttons and labels (six properties each) under one parent, or
// spread over 50 nested panels, at 1,000 / 10,000 / 100,000 controls: loading
// from binary and from text, saving to both, and freeing the form through its
// own teardown. Each figure carries `x_base`, its time over a baseline measured
// in the same run on the same data: the reader's own skip walk of the same
// stream for loading and saving, plain `new`/`delete` of as many blocks of the
// same sizes for freeing. Two failure paths are measured too: dropping what a
// read created when it fails after N siblings, and reading and freeing N
// references into a module that is not open. From N to 10N the times should
// grow about 10x.
//
// Example:
//   build/release/bench/kiln/fk_bench_kiln_forms --benchmark_min_time=0.2
//
//===----------------------------------------------------------------------===//
#include "bench/BenchTiming.h"
#include "frameworks/kiln/Kiln.h"
#include "platform/Filer.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <functional>

using namespace formkit;

namespace {

using bench::BestOf;
using bench::SecondsOf;

constexpr int PanelCount = 50;

/// A form of `Count` controls, alternately buttons and labels, each with position, size
/// and caption set: flat under the form, or spread over 50 panels nested five deep.
TForm* BuildForm(int Count, bool Nested) {
  auto* Form = CreateComponentOf<TForm>(nullptr);
  Form->SetName("Form1");
  std::vector<TWinControl*> Parents{Form};
  if (Nested)
    for (int P = 0; P < PanelCount; ++P) {
      auto* Panel = CreateComponentOf<TPanel>(Form);
      Panel->SetName("Panel" + IntToStr(P));
      Panel->SetParent(P % 10 == 0 ? static_cast<TWinControl*>(Form) : Parents.back());
      Panel->SetBounds(4, 4, 600, 400);
      Parents.push_back(Panel);
    }
  for (int I = 0; I < Count; ++I) {
    TWinControl* Parent = Nested ? Parents[1 + I % PanelCount] : Form;
    TControl* C = I % 2 ? static_cast<TControl*>(CreateComponentOf<TLabel>(Form))
                        : static_cast<TControl*>(CreateComponentOf<TButton>(Form));
    C->SetName((I % 2 ? "Label" : "Button") + IntToStr(I));
    C->SetParent(Parent);
    C->SetBounds(I % 640, I / 640, 75, 25);
    C->SetCaption("Caption " + IntToStr(I));
  }
  return Form;
}

std::vector<std::uint8_t> SaveBinary(TComponent* Root) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, nullptr);
    W->FlushBuffer();
  }
  return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
}

std::vector<std::uint8_t> Convert(const std::vector<std::uint8_t>& Bytes, bool ToText) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  if (ToText) ObjectBinaryToText(In.Get(), Out.Get());
  else ObjectTextToBinary(In.Get(), Out.Get());
  return std::vector<std::uint8_t>(Out->Memory(), Out->Memory() + Out->Size());
}

TForm* LoadBinary(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
  return static_cast<TForm*>(R->ReadRootComponent(CreateComponentOf<TForm>(nullptr)));
}

/// The reader's own walk over the stream, skipping every component: the floor of a load.
void SkipWalk(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
  R->ReadSignature();
  R->SkipComponent(true);
}

/// Plain objects as many and as large as a form's: for each control, one block of a
/// button's size and one of its font's, made and freed from the last to the first. The
/// floor of a teardown, touching as much memory.
void PlainNewDelete(int Count) {
  std::vector<char*> Blocks;
  Blocks.reserve(static_cast<std::size_t>(Count) * 2);
  for (int I = 0; I < Count; ++I) {
    Blocks.push_back(new char[sizeof(TButton)]);
    Blocks.push_back(new char[sizeof(TFont)]);
  }
  benchmark::DoNotOptimize(Blocks.data());
  for (std::size_t I = Blocks.size(); I-- > 0;) delete[] Blocks[I];
}

/// Runs `Step` (which times itself and returns seconds) and reports `x_base` against
/// `BaseSeconds`.
void Report(benchmark::State& State, double BaseSeconds, const std::function<double()>& Step) {
  double Total = 0;
  for (auto _ : State) {
    double Seconds = Step();
    State.SetIterationTime(Seconds);
    Total += Seconds;
  }
  State.counters["x_base"] = Total / static_cast<double>(State.iterations()) / BaseSeconds;
  State.SetItemsProcessed(State.iterations() * State.range(0));
}

int Count(const benchmark::State& State) { return static_cast<int>(State.range(0)); }
bool Nested(const benchmark::State& State) { return State.range(1) != 0; }

void BM_LoadBinary(benchmark::State& State) {
  std::vector<std::uint8_t> Bytes;
  {
    TObjectGuard<TForm> Form(BuildForm(Count(State), Nested(State)));
    Bytes = SaveBinary(Form.Get());
  }
  Report(State, BestOf(3, [&] { SkipWalk(Bytes); }), [&] {
    TForm* Form = nullptr;
    double Seconds = SecondsOf([&] { Form = LoadBinary(Bytes); });
    Form->Destroy();
    return Seconds;
  });
}

void BM_LoadText(benchmark::State& State) {
  std::vector<std::uint8_t> Bytes, Text;
  {
    TObjectGuard<TForm> Form(BuildForm(Count(State), Nested(State)));
    Bytes = SaveBinary(Form.Get());
    Text = Convert(Bytes, true);
  }
  Report(State, BestOf(3, [&] { SkipWalk(Bytes); }), [&] {
    TForm* Form = nullptr;
    double Seconds = SecondsOf([&] { Form = LoadBinary(Convert(Text, false)); });
    Form->Destroy();
    return Seconds;
  });
}

void BM_SaveBinary(benchmark::State& State) {
  TObjectGuard<TForm> Form(BuildForm(Count(State), Nested(State)));
  std::vector<std::uint8_t> Bytes = SaveBinary(Form.Get());
  Report(State, BestOf(3, [&] { SkipWalk(Bytes); }),
         [&] { return SecondsOf([&] { benchmark::DoNotOptimize(SaveBinary(Form.Get())); }); });
}

void BM_SaveText(benchmark::State& State) {
  TObjectGuard<TForm> Form(BuildForm(Count(State), Nested(State)));
  std::vector<std::uint8_t> Bytes = SaveBinary(Form.Get());
  Report(State, BestOf(3, [&] { SkipWalk(Bytes); }),
         [&] { return SecondsOf([&] { benchmark::DoNotOptimize(Convert(SaveBinary(Form.Get()), true)); }); });
}

void BM_Free(benchmark::State& State) {
  // As many plain objects as the form has components, the form itself included.
  int Objects = Count(State) + (Nested(State) ? PanelCount : 0) + 1;
  Report(State, BestOf(3, [&] { PlainNewDelete(Objects); }), [&] {
    TForm* Form = BuildForm(Count(State), Nested(State));
    return SecondsOf([&] { Form->Destroy(); });
  });
}

//===----------------------------------------------------------------------===//
// Failure paths
//===----------------------------------------------------------------------===//

/// A panel of N buttons followed by a component of an unknown class: the read fails and
/// drops everything it made. Against the same read without the unknown component.
void BM_FailedReadDrops(benchmark::State& State) {
  auto Text = [&](bool Bad) {
    String T = "object Form1: TForm\n  object Panel1: TPanel\n";
    for (int I = 0; I < Count(State); ++I)
      T += "    object Button" + IntToStr(I) + ": TButton\n      Left = " + IntToStr(I % 640) + "\n    end\n";
    if (Bad) T += "    object Bad: TNoSuchControl\n    end\n";
    return T + "  end\nend\n";
  };
  String Good = Text(false), Bad = Text(true);
  auto Load = [](const String& T) {
    std::vector<std::uint8_t> Bytes = Convert(std::vector<std::uint8_t>(T.begin(), T.end()), false);
    TObjectGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
    TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
    TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
    try {
      R->ReadRootComponent(Form.Get());
    } catch (const EReadError&) {
    }
  };
  Report(State, BestOf(3, [&] { Load(Good); }), [&] { return SecondsOf([&] { Load(Bad); }); });
}

/// N references into a module that is not open: read them, then free the module. Against
/// the same module whose references name its own components.
void BM_UnresolvedReferences(benchmark::State& State) {
  auto Text = [&](const char* Target) {
    String T = "object Form1: TForm\n";
    for (int I = 0; I < Count(State); ++I)
      T += "  object Label" + IntToStr(I) + ": TLabel\n    FocusControl = " + Target + "\n  end\n";
    return T + "  object Edit1: TEdit\n  end\nend\n";
  };
  auto Bytes = [&](const String& T) { return Convert(std::vector<std::uint8_t>(T.begin(), T.end()), false); };
  std::vector<std::uint8_t> Local = Bytes(Text("Edit1")), Remote = Bytes(Text("Other.Edit1"));
  auto LoadAndFree = [](const std::vector<std::uint8_t>& B) { LoadBinary(B)->Destroy(); };
  Report(State, BestOf(3, [&] { LoadAndFree(Local); }), [&] { return SecondsOf([&] { LoadAndFree(Remote); }); });
}

void Shapes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n", "nested"});
  for (int IsNested : {0, 1})
    for (int N : {1000, 10000, 100000}) B->Args({N, IsNested});
  B->Unit(benchmark::kMillisecond)->UseManualTime();
}

void Sizes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n"});
  for (int N : {2000, 20000}) B->Args({N});
  B->Unit(benchmark::kMillisecond)->UseManualTime();
}

BENCHMARK(BM_LoadBinary)->Apply(Shapes);
BENCHMARK(BM_LoadText)->Apply(Shapes);
BENCHMARK(BM_SaveBinary)->Apply(Shapes);
BENCHMARK(BM_SaveText)->Apply(Shapes);
BENCHMARK(BM_Free)->Apply(Shapes);
BENCHMARK(BM_FailedReadDrops)->Apply(Sizes);
BENCHMARK(BM_UnresolvedReferences)->Apply(Sizes);

} // namespace

int main(int argc, char** argv) {
  InitializeKiln();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  FinalizeKiln();
  return 0;
}
