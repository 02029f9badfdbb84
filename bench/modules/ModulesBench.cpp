//===- bench/modules/ModulesBench.cpp - Modules opened and saved through the designer ===//
//
// Generated Kiln modules in a scratch directory, opened (`CreateRoot` of an existing
// file) and saved (`Save` after a change) through the designer with a recording host:
//
//   - flat: one form holding n buttons;
//   - nested: one form holding n / 10 panels of 9 buttons each;
//   - descendant: a form inheriting from a flat one of n buttons, with five overrides
//     and one component of its own; its ancestor stays open.
//
// `x_base` of an open is against a raw walk over the same bytes (a reader that skips
// every value; for the descendant, its ancestor's file and its own), `x_plain_read`
// against the framework's reader making the same components in a form that is not on
// design (the designer's own share); `x_base` of a save is against
// a raw serialisation of the same components into memory. `bytes_per_component` is the
// heap an open module holds, over its components.
//
// Example:
//   build/release/bench/modules/fk_bench_modules --benchmark_filter=Open
//
//===----------------------------------------------------------------------===//
#include "bench/BenchTiming.h"
#include "bench/KilnDesignRun.h"
#include "core/root/ComponentRoot.h"
#include "platform/Filer.h"
#include "tests/fakes/RecordingModule.h"

#include <benchmark/benchmark.h>

#include <filesystem>
#include <malloc.h>

using namespace formkit;

namespace {

using bench::BestOf;
using bench::SecondsOf;

using bench::Run;

/// The scratch directory of the run's modules.
std::filesystem::path& Dir() {
  static std::filesystem::path Path;
  return Path;
}

enum TShape { shFlat, shNested, shDescendant };

String PathOf(const String& Name) { return (Dir() / (Name + ".kfm")).string(); }

TComponentRoot* RootOf(const IPtr<IRoot>& Root) {
  return dynamic_cast<TComponentRoot*>(QueryAs<IInternalRoot>(Root)->Implementor());
}

IPtr<IRoot> NewModule(const String& Name, const String& Ancestor) {
  IPtr<fakes::TRecordingModule> Module = New<fakes::TRecordingModule>(PathOf(Name), &Run().Log);
  return Run().Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf(Name), false, Name, Ancestor, "",
                                   nullptr, "");
}

IPtr<IRoot> OpenModule(const String& Name, const String& AncestorClass) {
  IPtr<fakes::TRecordingModule> Module = New<fakes::TRecordingModule>(PathOf(Name), &Run().Log);
  Module->AncestorClassName = AncestorClass;
  return Run().Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf(Name), true, "", "", "", nullptr,
                                   "");
}

/// Adds `Count` components of the shape to an empty module, without the designer's
/// per-creation work (the module is saved right after).
void Fill(const IPtr<IRoot>& Form, int Count, TShape Shape) {
  auto* Root = static_cast<TWinControl*>(Form->GetRoot());
  int Made = 0;
  auto Button = [&](TWinControl* Parent, int I) {
    auto* B = CreateComponentOf<TButton>(Root);
    B->SetName("Button" + IntToStr(++Made));
    B->SetBounds(8 + (I % 10) * 80, 8 + (I / 10 % 100) * 30, 75, 25);
    B->SetParent(Parent);
  };
  if (Shape != shNested) {
    for (int I = 0; I < Count; ++I) Button(Root, I);
    return;
  }
  for (int P = 0; P < Count / 10; ++P) {
    auto* Panel = CreateComponentOf<TPanel>(Root);
    Panel->SetName("Panel" + IntToStr(P + 1));
    Panel->SetParent(Root);
    for (int I = 0; I < 9; ++I) Button(Panel, I);
  }
}

std::vector<std::uint8_t> FileBytes(const String& Path) {
  TObjectGuard<TFileStream> F(new TFileStream(Path, fmOpenRead));
  std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(F->Size()));
  F->ReadBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  return Bytes;
}

/// Reads every value of a form file and keeps none.
void RawWalk(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
  S->ReadResHeader();
  TObjectGuard<TReader> Reader(new TReader(S.Get(), 4096));
  Reader->ReadSignature();
  Reader->SkipComponent(true);
}

/// Reads a form file into a plain form, not on design, with the framework's reader
/// alone: the same components made, without a designer. Ancestor files first.
void PlainRead(const std::vector<const std::vector<std::uint8_t>*>& Files) {
  TObjectGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  for (const auto* Bytes : Files) {
    TObjectGuard<TBytesStream> S(new TBytesStream(*Bytes));
    S->ReadResHeader();
    TObjectGuard<TReader> Reader(new TReader(S.Get(), 4096));
    Reader->ReadRootComponent(Form.Get());
  }
}

std::size_t HeapInUse() { return mallinfo2().uordblks; }

/// Writes the modules of one benchmark and removes them with it.
struct TModules {
  IPtr<IRoot> Ancestor; // open for the descendant shape
  String Name = "Form1";
  String AncestorClass;
  std::vector<std::uint8_t> WalkBytes[2];
  int Components = 0;

  TModules(int Count, TShape Shape) {
    if (Shape == shDescendant) {
      Ancestor = NewModule("Base", "");
      Fill(Ancestor, Count, shFlat);
      Ancestor->Save();
      IPtr<IRoot> Heir = NewModule("Heir", "Base");
      for (int I = 1; I <= 5; ++I)
        static_cast<TButton*>(Heir->GetRoot()->FindComponent("Button" + IntToStr(I * Count / 5)))->SetCaption("Own");
      RootOf(Heir)->CreateComponent(TEdit::StaticClass(), Heir->GetRoot(), 8, 8, 121, 23);
      Heir->Save();
      Heir->Close();
      Name = "Heir";
      AncestorClass = "TBase";
      WalkBytes[1] = FileBytes(PathOf("Base"));
    } else {
      IPtr<IRoot> Form = NewModule(Name, "");
      Fill(Form, Count, Shape);
      Form->Save();
      Form->Close();
    }
    WalkBytes[0] = FileBytes(PathOf(Name));
    Components = Count + (Shape == shNested ? Count / 10 : 0);
  }
  ~TModules() {
    if (Ancestor) Ancestor->Close();
  }
  void Walk() const {
    for (const auto& Bytes : WalkBytes)
      if (!Bytes.empty()) RawWalk(Bytes);
  }
  void Read() const {
    if (WalkBytes[1].empty()) PlainRead({&WalkBytes[0]});
    else PlainRead({&WalkBytes[1], &WalkBytes[0]});
  }
};

void BM_Open(benchmark::State& State) {
  TModules Modules(static_cast<int>(State.range(0)), static_cast<TShape>(State.range(1)));
  double Base = BestOf(3, [&] { Modules.Walk(); });
  double Plain = BestOf(3, [&] { Modules.Read(); });
  IPtr<IRoot> Open;
  std::size_t Before = HeapInUse();
  Open = OpenModule(Modules.Name, Modules.AncestorClass);
  State.counters["bytes_per_component"] = static_cast<double>(HeapInUse() - Before) / Modules.Components;
  Open->Close();
  Open = nullptr;
  bench::ReportAgainstBase(
      State, Base, [&] { Open = OpenModule(Modules.Name, Modules.AncestorClass); },
      [&] {
        Open->Close();
        Open = nullptr;
        Run().Log.Clear();
      });
  State.counters["x_plain_read"] = State.counters["x_base"] * Base / Plain;
}

void BM_Save(benchmark::State& State) {
  TModules Modules(static_cast<int>(State.range(0)), static_cast<TShape>(State.range(1)));
  IPtr<IRoot> Open = OpenModule(Modules.Name, Modules.AncestorClass);
  TComponent* Ancestor = Modules.Ancestor ? Modules.Ancestor->GetRoot() : nullptr;
  double Base = BestOf(3, [&] {
    TObjectGuard<TMemoryStream> S(new TMemoryStream);
    TObjectGuard<TWriter> Writer(new TWriter(S.Get(), 4096));
    Writer->WriteDescendent(Open->GetRoot(), Ancestor);
  });
  auto* Button = static_cast<TButton*>(Open->GetRoot()->FindComponent("Button1"));
  int Edit = 0;
  bench::ReportAgainstBase(
      State, Base,
      [&] {
        Button->SetCaption("Edit" + IntToStr(++Edit));
        RootOf(Open)->Modified();
        Open->Save();
      },
      [&] { Run().Log.Clear(); });
  Open->Close();
}

void Shapes(benchmark::internal::Benchmark* B) {
  B->ArgNames({"n", "shape"});
  for (int Shape : {shFlat, shNested, shDescendant})
    for (int N : {1000, 10000, 100000}) B->Args({N, Shape});
  B->Unit(benchmark::kMillisecond)->UseManualTime()->Iterations(3);
}

BENCHMARK(BM_Open)->Apply(Shapes);
BENCHMARK(BM_Save)->Apply(Shapes);

} // namespace

int main(int argc, char** argv) {
  char Template[] = "/tmp/fk-bench-modules-XXXXXX";
  Dir() = ::mkdtemp(Template);
  int Code = bench::RunWithKilnDesigner(argc, argv);
  std::filesystem::remove_all(Dir());
  return Code;
}
