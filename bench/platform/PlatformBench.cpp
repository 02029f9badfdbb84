//===- bench/platform/PlatformBench.cpp - Object model costs -------------===//
//
// Property access through the generic accessors against direct calls, the
// property list of a class with 50 published properties, FindComponent in an
// owner of 10,000 components, and creating and freeing owned components at
// 10,000 and 100,000 (the growth must be linear).
//
//===----------------------------------------------------------------------===//
#include "platform/Classes.h"

#include <benchmark/benchmark.h>

using namespace formkit;

namespace {

class TWide : public TComponent {
  FK_CLASS(TWide, TComponent)
  int Width() const { return FWidth; }
  void SetWidth(int Value) { FWidth = Value; }
  int FWidth = 0;
  int P0 = 0;
  int P1 = 1;
  int P2 = 2;
  int P3 = 3;
  int P4 = 4;
  int P5 = 5;
  int P6 = 6;
  int P7 = 7;
  int P8 = 8;
  int P9 = 9;
  int P10 = 10;
  int P11 = 11;
  int P12 = 12;
  int P13 = 13;
  int P14 = 14;
  int P15 = 15;
  int P16 = 16;
  int P17 = 17;
  int P18 = 18;
  int P19 = 19;
  int P20 = 20;
  int P21 = 21;
  int P22 = 22;
  int P23 = 23;
  int P24 = 24;
  int P25 = 25;
  int P26 = 26;
  int P27 = 27;
  int P28 = 28;
  int P29 = 29;
  int P30 = 30;
  int P31 = 31;
  int P32 = 32;
  int P33 = 33;
  int P34 = 34;
  int P35 = 35;
  int P36 = 36;
  int P37 = 37;
  int P38 = 38;
  int P39 = 39;
  int P40 = 40;
  int P41 = 41;
  int P42 = 42;
  int P43 = 43;
  int P44 = 44;
  int P45 = 45;
  int P46 = 46;
  int P47 = 47;
  int P48 = 48;
  int P49 = 49;
};

FK_IMPLEMENT(TWide, "Bench") {
  B.Property("Width", &TWide::Width, &TWide::SetWidth);
  B.Field("Prop00", &TWide::P0);
  B.Field("Prop01", &TWide::P1);
  B.Field("Prop02", &TWide::P2);
  B.Field("Prop03", &TWide::P3);
  B.Field("Prop04", &TWide::P4);
  B.Field("Prop05", &TWide::P5);
  B.Field("Prop06", &TWide::P6);
  B.Field("Prop07", &TWide::P7);
  B.Field("Prop08", &TWide::P8);
  B.Field("Prop09", &TWide::P9);
  B.Field("Prop10", &TWide::P10);
  B.Field("Prop11", &TWide::P11);
  B.Field("Prop12", &TWide::P12);
  B.Field("Prop13", &TWide::P13);
  B.Field("Prop14", &TWide::P14);
  B.Field("Prop15", &TWide::P15);
  B.Field("Prop16", &TWide::P16);
  B.Field("Prop17", &TWide::P17);
  B.Field("Prop18", &TWide::P18);
  B.Field("Prop19", &TWide::P19);
  B.Field("Prop20", &TWide::P20);
  B.Field("Prop21", &TWide::P21);
  B.Field("Prop22", &TWide::P22);
  B.Field("Prop23", &TWide::P23);
  B.Field("Prop24", &TWide::P24);
  B.Field("Prop25", &TWide::P25);
  B.Field("Prop26", &TWide::P26);
  B.Field("Prop27", &TWide::P27);
  B.Field("Prop28", &TWide::P28);
  B.Field("Prop29", &TWide::P29);
  B.Field("Prop30", &TWide::P30);
  B.Field("Prop31", &TWide::P31);
  B.Field("Prop32", &TWide::P32);
  B.Field("Prop33", &TWide::P33);
  B.Field("Prop34", &TWide::P34);
  B.Field("Prop35", &TWide::P35);
  B.Field("Prop36", &TWide::P36);
  B.Field("Prop37", &TWide::P37);
  B.Field("Prop38", &TWide::P38);
  B.Field("Prop39", &TWide::P39);
  B.Field("Prop40", &TWide::P40);
  B.Field("Prop41", &TWide::P41);
  B.Field("Prop42", &TWide::P42);
  B.Field("Prop43", &TWide::P43);
  B.Field("Prop44", &TWide::P44);
  B.Field("Prop45", &TWide::P45);
  B.Field("Prop46", &TWide::P46);
  B.Field("Prop47", &TWide::P47);
  B.Field("Prop48", &TWide::P48);
  B.Field("Prop49", &TWide::P49);
}

// Baseline: the same getter and setter called directly, through a pointer the
// optimiser cannot see through.
void DirectGetSet(benchmark::State& State) {
  TWide* W = CreateComponentOf<TWide>(nullptr);
  TWide* volatile Target = W;
  for (auto _ : State) {
    TWide* T = Target;
    T->SetWidth(T->Width() + 1);
    benchmark::DoNotOptimize(T->FWidth);
  }
  W->Destroy();
}
BENCHMARK(DirectGetSet);

void GenericGetSet(benchmark::State& State) {
  TWide* W = CreateComponentOf<TWide>(nullptr);
  PPropInfo P = GetPropInfo(W, "Width");
  for (auto _ : State) SetOrdProp(W, P, GetOrdProp(W, P) + 1);
  benchmark::DoNotOptimize(W->FWidth);
  W->Destroy();
}
BENCHMARK(GenericGetSet);

void GenericGetSetByName(benchmark::State& State) {
  TWide* W = CreateComponentOf<TWide>(nullptr);
  for (auto _ : State) {
    PPropInfo P = GetPropInfo(W, "Width");
    SetOrdProp(W, P, GetOrdProp(W, P) + 1);
  }
  W->Destroy();
}
BENCHMARK(GenericGetSetByName);

void PropListOf51(benchmark::State& State) {
  PTypeInfo Info = TWide::StaticClass()->TypeInfo();
  std::vector<PPropInfo> List;
  for (auto _ : State) {
    List.clear();
    int Count = GetPropList(Info, TTypeKinds{tkInteger}, nullptr);
    List.reserve(static_cast<size_t>(Count));
    GetPropList(Info, TTypeKinds{tkInteger}, &List);
    benchmark::DoNotOptimize(List.data());
  }
}
BENCHMARK(PropListOf51);

/// Fills an owner with `N` named components.
TComponent* FilledOwner(int N) {
  TComponent* Owner = CreateComponentOf<TComponent>(nullptr);
  for (int I = 0; I < N; ++I) CreateComponentOf<TComponent>(Owner)->ChangeName("Comp" + std::to_string(I));
  return Owner;
}

void FindComponentIn(benchmark::State& State) {
  int N = static_cast<int>(State.range(0));
  TComponent* Owner = FilledOwner(N);
  int I = 0;
  for (auto _ : State) {
    benchmark::DoNotOptimize(Owner->FindComponent("comp" + std::to_string(I)));
    I = (I + 7919) % N;
  }
  Owner->Destroy();
}
BENCHMARK(FindComponentIn)->Arg(1000)->Arg(10000);

// Baseline for FindComponent: a linear scan of the owner with CompareText.
void LinearScanIn(benchmark::State& State) {
  int N = static_cast<int>(State.range(0));
  TComponent* Owner = FilledOwner(N);
  int I = 0;
  for (auto _ : State) {
    String Name = "comp" + std::to_string(I);
    TComponent* Found = nullptr;
    for (int K = 0; K < Owner->ComponentCount() && !Found; ++K)
      if (SameText(Owner->Components(K)->Name(), Name)) Found = Owner->Components(K);
    benchmark::DoNotOptimize(Found);
    I = (I + 7919) % N;
  }
  Owner->Destroy();
}
BENCHMARK(LinearScanIn)->Arg(1000)->Arg(10000);

void CreateAndFreeOwned(benchmark::State& State) {
  int N = static_cast<int>(State.range(0));
  for (auto _ : State) {
    TComponent* Owner = CreateComponentOf<TComponent>(nullptr);
    for (int I = 0; I < N; ++I) {
      TComponent* C = CreateComponentOf<TWide>(Owner);
      C->SetName("Wide" + std::to_string(I));
    }
    Owner->Destroy();
  }
  State.SetItemsProcessed(State.iterations() * N);
}
BENCHMARK(CreateAndFreeOwned)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

// Baseline for creation: plain heap objects of the same size in a vector.
void NewAndDeletePlain(benchmark::State& State) {
  int N = static_cast<int>(State.range(0));
  struct Plain { char Bytes[sizeof(TWide)]; std::string Name; };
  for (auto _ : State) {
    std::vector<Plain*> All;
    for (int I = 0; I < N; ++I) {
      All.push_back(new Plain);
      All.back()->Name = "Wide" + std::to_string(I);
    }
    for (size_t I = All.size(); I-- > 0;) delete All[I];
  }
  State.SetItemsProcessed(State.iterations() * N);
}
BENCHMARK(NewAndDeletePlain)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

} // namespace

BENCHMARK_MAIN();
