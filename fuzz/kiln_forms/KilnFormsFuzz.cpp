//===- fuzz/kiln_forms/KilnFormsFuzz.cpp - Kiln modules from the fuzzer ----===//
//
// Reads each input as a Kiln module, with the framework's classes and the sample
// classes of a program (forms, frames, data modules, a panel with references)
// registered:
//
//   - the conversions, binary to text and text to binary, with and without a
//     resource header: what converts must convert back exactly;
//   - a root read into a form, on a design surface or running, and a root
//     created from the class the data names, with an `OnError` handler that
//     goes on past every error (the reader skips what is at fault);
//   - a read over a form that already holds an ancestor's components, as a
//     descendant is read, with or without going on past errors;
//   - `ReadComponents` into a live module, into its form or one of its panels,
//     as a paste is.
//
// The variant of each read comes from the input's hash. Bad input must end in
// `EReadError`; anything else is a finding. Whatever reads successfully is
// written, read back and written again to the same bytes, and freed.
//
// Example:
//   build/test/fuzz/kiln_forms/fk_fuzz_kiln_forms -runs=20000 scratch/ corpus/
//
//===----------------------------------------------------------------------===//
#include "fuzz/support/KilnSamples.h"

using namespace formkit;
using namespace formkit::fuzzing;

namespace {

/// What each run reads over, made once.
struct TBase {
  TBytes ModuleA;
  TBytes Ancestor;
  /// A live ancestor that descendants are written against; never changed.
  TComponent* AncestorRoot = nullptr;
};

/// Made on first use.
const TBase& Base() {
  static const TBase B = [] {
    TBase Result;
    TObjectGuard<TSampleForm> A(BuildModuleA());
    Result.ModuleA = WriteRoot(A.Get());
    TObjectGuard<TSampleForm> Ancestor(BuildAncestor());
    Result.Ancestor = WriteRoot(Ancestor.Get());
    Result.AncestorRoot = Ancestor.Release();
    return Result;
  }();
  return B;
}

/// Makes roots of one kind, on a design surface or not.
TNewRoot Maker(TNewRoot Make, bool Designing) {
  return [Make, Designing] {
    TComponent* Root = Make();
    if (Designing) Root->SetDesigning(true);
    return Root;
  };
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  StartKilnSamples();
  Base();
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  CheckConversions(Data, Size);
  TBytes Stream;
  if (ComponentData(Data, Size, Stream)) {
    std::uint32_t Variant = InputHash(Data, Size);
    bool Designing = Variant & 1;
    bool Skip = Variant & 2;
    static const TNewRoot Kinds[] = {NewSampleForm, NewSampleFrame, NewSampleDataModule, NewSampleForm};
    CheckRootRead(Stream, Maker(Kinds[(Variant >> 2) & 3], Designing), false);
    CheckRootRead(Stream, nullptr, true);
    const TBytes& AncestorData = Base().Ancestor;
    CheckRootRead(Stream, Maker([&] { return NewDescendantRoot(AncestorData); }, Designing), Skip,
                  Base().AncestorRoot);
  }
  TBytes List;
  if (ComponentListData(Data, Size, List)) {
    // Pasted into a live module A: into its form, a panel or the link panel.
    std::uint32_t Variant = InputHash(Data, Size) >> 4;
    TNewRoot NewForm = Maker(NewSampleForm, Variant & 8);
    TObjectGuard<TComponent> Host(ReadRoot(Base().ModuleA, NewForm));
    static const char* const Parents[] = {"", "Panel1", "LinkPanel1", ""};
    const char* ParentName = Parents[Variant & 3];
    TComponent* Parent = *ParentName ? FindNestedComponent(Host.Get(), ParentName) : Host.Get();
    CheckPaste(List, Host.Get(), Parent, Variant & 4, NewForm);
  }
  // Messages queued for controls of this run go now, not into the next run.
  ProcessMessages();
  return 0;
}
