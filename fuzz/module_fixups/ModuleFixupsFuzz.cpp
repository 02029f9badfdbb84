//===- fuzz/module_fixups/ModuleFixupsFuzz.cpp - References across modules -===//
//
// Reads each input as module B of a program whose other module, "ModuleA" (a
// real Kiln form), its references may name: directly, through an interface, and
// from the items of a collection. Open modules are found by name, as a designer
// finds them; the order varies with the input's hash:
//
//   - B is read inside a loading bracket, strictly or going on past every error,
//     usually before A, so that its references to A wait as global fix-ups until
//     A is opened and `GlobalFixupReferences` resolves them; sometimes after A;
//   - A is read inside a loading bracket of its own, or plainly and found
//     afterwards;
//   - with both open, nothing B still waits for is in A, and B writes, reads
//     back and writes the same bytes;
//   - then A or B is freed first, the fix-ups are retried, and what is left of
//     B writes and reads back the same; then the other is freed.
//
// At the end no fix-up may remain for a freed module, and a fresh ModuleA that
// opens must find nothing left to write into. Bad input must end in
// `EReadError`; anything else is a finding.
//
// Example:
//   build/test/fuzz/module_fixups/fk_fuzz_module_fixups -runs=20000 scratch/ corpus/
//
//===----------------------------------------------------------------------===//
#include "fuzz/support/KilnSamples.h"

#include "platform/ScopeGuard.h"

#include <algorithm>

using namespace formkit;
using namespace formkit::fuzzing;

namespace {

/// The data of module A, made once.
const TBytes& ModuleAData() {
  static const TBytes Data = [] {
    TObjectGuard<TSampleForm> A(BuildModuleA());
    return WriteRoot(A.Get());
  }();
  return Data;
}

/// The modules open in a run, found by name as a designer finds them; freed with the run.
class TOpenModules {
public:
  TOpenModules() {
    FToken = RegisterFindGlobalComponentProc([this](const String& Name) -> TComponent* {
      for (TComponent* M : FModules)
        if (SameText(M->Name(), Name)) return M;
      return nullptr;
    });
  }
  ~TOpenModules() {
    while (!FModules.empty()) Close(FModules.back());
    UnregisterFindGlobalComponentProc(FToken);
  }
  TOpenModules(const TOpenModules&) = delete;
  TOpenModules& operator=(const TOpenModules&) = delete;

  /// Reads `Data` into a new sample form, going on past errors when `Skip`, inside a
  /// loading bracket when `Bracket`, and opens it; null when the read failed.
  TComponent* Open(const TBytes& Data, bool Skip, bool Bracket) {
    TObjectGuard<TComponent> Root(NewSampleForm());
    TObjectGuard<TBytesStream> In(new TBytesStream(Data));
    TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
    TSkipErrors Errors;
    if (Skip) Errors.Attach(R.Get());
    if (Bracket) BeginGlobalLoading();
    auto End = Finally([&]() noexcept {
      if (Bracket) EndGlobalLoading();
    });
    try {
      R->ReadRootComponent(Root.Get());
      if (Bracket) NotifyGlobalLoading();
    } catch (const EReadError&) {
      return nullptr;
    }
    FModules.push_back(Root.Release());
    return FModules.back();
  }

  /// Frees an open module.
  void Close(TComponent* Module) {
    std::erase(FModules, Module);
    Module->Destroy();
  }

private:
  std::vector<TComponent*> FModules;
  int FToken = 0;
};

/// No fix-up may name a module that was freed. Only compares the address.
void RequireNoFixupsOf(TComponent* Freed) {
  if (!Freed) return;
  std::vector<String> Names;
  GetFixupReferenceNames(Freed, Names);
  Require(Names.empty(), "a freed module still has pending references");
}

/// Opens module A again, so that a fix-up left over from a module that is gone would be
/// written now (into freed memory, which the sanitizer reports), and closes it.
void ProbeLeftovers() {
  TOpenModules Probe;
  TComponent* A = Probe.Open(ModuleAData(), false, false);
  Require(A != nullptr, "module A does not read");
  GlobalFixupReferences();
}

/// B round-trips with the modules open now: its references to A resolve on reading.
void CheckModuleB(TComponent* B) {
  if (B) CheckRoundTrip(B, NewSampleForm);
}

/// Once A is open and the fix-ups were retried, what B still waits for in A is not there.
void RequireResolvedInto(TComponent* B, TComponent* A) {
  // A module B of the same name would be found in A's place.
  if (!B || SameText(B->Name(), A->Name())) return;
  std::vector<String> Paths;
  GetFixupInstanceNames(B, A->Name(), Paths);
  for (const String& Path : Paths)
    Require(!FindNestedComponent(A, Path), "a reference into an open module is still pending");
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  StartKilnSamples();
  ModuleAData();
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  TBytes Stream;
  if (!ComponentData(Data, Size, Stream)) return 0;
  std::uint32_t Variant = InputHash(Data, Size);
  bool SkipErrors = Variant & 1;
  bool BracketA = Variant & 2;
  bool FreeAFirst = Variant & 4;
  bool OpenAFirst = (Variant & 0x18) == 0x18;

  TComponent* FreedA = nullptr;
  TComponent* FreedB = nullptr;
  {
    TOpenModules Modules;
    TComponent* A = OpenAFirst ? Modules.Open(ModuleAData(), false, BracketA) : nullptr;
    TComponent* B = Modules.Open(Stream, SkipErrors, true);
    if (!A) A = Modules.Open(ModuleAData(), false, BracketA);
    Require(A != nullptr, "module A does not read");
    GlobalFixupReferences();
    RequireResolvedInto(B, A);
    CheckModuleB(B);

    // One goes first; the fix-ups are retried with the other still open.
    if (TComponent* First = FreeAFirst ? A : B) {
      Modules.Close(First);
      GlobalFixupReferences();
      if (First == B) RequireNoFixupsOf(B);
      else CheckModuleB(B);
    }
    FreedA = A;
    FreedB = B;
  }
  RequireNoFixupsOf(FreedA);
  RequireNoFixupsOf(FreedB);
  ProbeLeftovers();
  // Messages queued for controls of this run go now, not into the next run.
  ProcessMessages();
  return 0;
}
