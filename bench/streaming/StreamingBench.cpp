//===- bench/streaming/StreamingBench.cpp - Streaming component trees -----===//
//
// Writes 1,000 / 10,000 / 100,000 components (flat under the root, or nested ten
// to a parent) to binary data, reads them back into a new root, and converts the
// data to text. Each figure carries `x_raw`: its time over a raw walk and copy of
// the same bytes measured in the same run, so the ratios, not the absolute times
// of a shared machine, are what to compare; from N to 10N they should stay flat.
//
// Example:
//   build/release/bench/streaming/fk_bench_streaming --benchmark_min_time=0.2
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstring>
#include <deque>

using namespace formkit;

namespace bench {

FK_ENUM(TBenchTone, std::uint8_t, btLow, btMid, btHigh)

class TBenchControl : public TComponent {
  FK_CLASS(TBenchControl, TComponent)
  TComponent* GetParentComponent() override { return FParent; }
  bool HasParent() override { return true; }
  void SetParentComponent(TComponent* AParent) override {
    auto* P = dynamic_cast<TBenchControl*>(AParent);
    if (P == FParent) return;
    if (FParent) std::erase(FParent->FControls, this);
    FParent = P;
    if (P) P->FControls.push_back(this);
  }
  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override {
    for (TBenchControl* C : FControls)
      if (C->Owner() == Root) Proc(C);
  }
  void BeforeDestruction() override {
    // The whole tree goes with its root; children need not leave their parents one by one.
    for (TBenchControl* C : FControls) C->FParent = nullptr;
    FControls.clear();
    if (FParent) std::erase(FParent->FControls, this);
    FParent = nullptr;
    inherited::BeforeDestruction();
  }
  TBenchControl* FParent = nullptr;
  std::vector<TBenchControl*> FControls;
  int Left = 0, Top = 0, Width = 75;
  TBenchTone Tone = btMid;
  String Caption;
};

FK_IMPLEMENT(TBenchControl, "BenchUnit") {
  B.Field("Left", &TBenchControl::Left).Default(0);
  B.Field("Top", &TBenchControl::Top).Default(0);
  B.Field("Width", &TBenchControl::Width).Default(75);
  B.Field("Tone", &TBenchControl::Tone).Default(btMid);
  B.Field("Caption", &TBenchControl::Caption);
}

TComponent* BuildTree(int Count, bool Nested) {
  static const bool Registered = (RegisterClass(TBenchControl::StaticClass()), true);
  (void)Registered;
  auto* Root = static_cast<TBenchControl*>(CreateComponent(TBenchControl::StaticClass(), nullptr));
  Root->SetName("Root");
  std::deque<TBenchControl*> Parents{Root};
  for (int I = 0; I < Count; ++I) {
    TBenchControl* Parent = Parents.front();
    auto* C = static_cast<TBenchControl*>(CreateComponent(TBenchControl::StaticClass(), Root));
    C->ChangeName("Control" + IntToStr(I));
    C->SetParentComponent(Parent);
    C->Left = I % 640;
    C->Top = I / 640;
    C->Tone = static_cast<TBenchTone>(I % 3);
    C->Caption = "Caption " + IntToStr(I);
    if (Nested) {
      Parents.push_back(C);
      if (Parent->FControls.size() == 10) Parents.pop_front();
    }
  }
  return Root;
}

std::vector<std::uint8_t> Write(TComponent* Root) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, nullptr);
    W->FlushBuffer();
  }
  return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
}

/// The raw walk and copy over `Bytes`: the floor for anything that reads them.
double RawSeconds(const std::vector<std::uint8_t>& Bytes) {
  double Best = 1e9;
  std::vector<std::uint8_t> Copy(Bytes.size());
  for (int Rep = 0; Rep < 5; ++Rep) {
    auto T0 = std::chrono::steady_clock::now();
    std::uint64_t Sum = 0;
    for (std::uint8_t B : Bytes) Sum = Sum * 31 + B;
    std::memcpy(Copy.data(), Bytes.data(), Bytes.size());
    benchmark::DoNotOptimize(Sum);
    benchmark::DoNotOptimize(Copy.data());
    Best = std::min(Best, std::chrono::duration<double>(std::chrono::steady_clock::now() - T0).count());
  }
  return Best;
}

template <class F> void Run(benchmark::State& State, const std::vector<std::uint8_t>& Bytes, F&& Step) {
  double Raw = RawSeconds(Bytes);
  double Total = 0;
  for (auto _ : State) {
    auto T0 = std::chrono::steady_clock::now();
    Step(State);
    Total += std::chrono::duration<double>(std::chrono::steady_clock::now() - T0).count();
  }
  State.counters["bytes"] = static_cast<double>(Bytes.size());
  State.counters["x_raw"] = Total / static_cast<double>(State.iterations()) / Raw;
  State.SetItemsProcessed(State.iterations() * State.range(0));
}

void BM_WriteBinary(benchmark::State& State) {
  TObjectGuard<TComponent> Root(BuildTree(static_cast<int>(State.range(0)), State.range(1) != 0));
  std::vector<std::uint8_t> Bytes = Write(Root.Get());
  Run(State, Bytes, [&](benchmark::State&) { benchmark::DoNotOptimize(Write(Root.Get())); });
}

void BM_ReadBinary(benchmark::State& State) {
  std::vector<std::uint8_t> Bytes;
  {
    TObjectGuard<TComponent> Root(BuildTree(static_cast<int>(State.range(0)), State.range(1) != 0));
    Bytes = Write(Root.Get());
  }
  Run(State, Bytes, [&](benchmark::State& S) {
    TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
    TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
    TComponent* Root = CreateComponent(TBenchControl::StaticClass(), nullptr);
    R->ReadRootComponent(Root);
    S.PauseTiming();
    Root->Destroy();
    S.ResumeTiming();
  });
}

void BM_BinaryToText(benchmark::State& State) {
  std::vector<std::uint8_t> Bytes;
  {
    TObjectGuard<TComponent> Root(BuildTree(static_cast<int>(State.range(0)), State.range(1) != 0));
    Bytes = Write(Root.Get());
  }
  Run(State, Bytes, [&](benchmark::State&) {
    TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
    TObjectGuard<TMemoryStream> Out(new TMemoryStream);
    ObjectBinaryToText(In.Get(), Out.Get());
    benchmark::DoNotOptimize(Out->Memory());
  });
}

void Sizes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n", "nested"});
  for (int Nested : {0, 1})
    for (int N : {1000, 10000, 100000}) B->Args({N, Nested});
  B->Unit(benchmark::kMillisecond);
}

BENCHMARK(BM_WriteBinary)->Apply(Sizes);
BENCHMARK(BM_ReadBinary)->Apply(Sizes);
BENCHMARK(BM_BinaryToText)->Apply(Sizes);

} // namespace bench

BENCHMARK_MAIN();
