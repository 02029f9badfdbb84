//===- fuzz/form_reader/FormReaderFuzz.cpp - Fuzzing the form reader ------===//
//
// Feeds each input to every reader of form data, over the streaming test
// family (controls with every kind of property, a collection whose items hold
// references, a sub-object, a defined binary property):
//
//   - the conversions, binary to text and text to binary, with and without a
//     resource header: what converts must convert back exactly;
//   - a root read into a form, and a root created from the class the data names;
//   - a read that an `OnError` handler carries on past every error, so that the
//     reader skips the property or component at fault and reads the rest;
//   - a read over a form that already holds the components of an ancestor, as
//     a descendant is read;
//   - `ReadComponents` into a live form, as a paste is.
//
// Bad input must end in `EReadError`; anything else (a crash, a leak, another
// exception, a failed check) is a finding. Whatever reads successfully is
// written, read back and written again to the same bytes, and freed.
//
// Example:
//   build/test/fuzz/form_reader/fk_fuzz_form_reader -runs=20000 scratch/ corpus/
//
//===----------------------------------------------------------------------===//
#include "fuzz/support/StreamChecks.h"
#include "tests/platform/StreamingFixtures.h"

using namespace formkit;
using namespace formkit::fuzzing;
using namespace formkit::streamtest;

namespace {

/// An empty form of the test family.
TComponent* NewTestForm() { return CreateComponent(TTestForm::StaticClass(), nullptr); }

/// The rich form, as data: the ancestor of descendant reads and the host of pastes.
const TBytes& RichData() {
  static const TBytes Data = [] {
    TObjectGuard<TTestForm> Form(BuildRichForm());
    return WriteRoot(Form.Get());
  }();
  return Data;
}

/// A live rich form that descendants are written against; never changed.
TComponent* RichAncestor() {
  static TComponent* const Ancestor = ReadRoot(RichData(), NewTestForm);
  return Ancestor;
}

/// A new rich form, read from its data.
TComponent* NewRichForm() { return ReadRoot(RichData(), NewTestForm); }

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  RegisterStreamingClasses();
  RichAncestor();
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  CheckConversions(Data, Size);
  TBytes Stream;
  if (!ComponentData(Data, Size, Stream)) return 0;
  std::uint32_t Variant = InputHash(Data, Size);
  bool Skip = Variant & 1;

  CheckRootRead(Stream, NewTestForm, false);
  CheckRootRead(Stream, nullptr, true);
  CheckRootRead(Stream, NewRichForm, Skip, RichAncestor());
  TBytes List;
  if (ComponentListData(Data, Size, List)) {
    // Pasted into a rich form, at the top or under its panel.
    TObjectGuard<TComponent> Host(NewRichForm());
    TComponent* Parent = Variant & 2 ? Host->FindComponent("Panel1") : Host.Get();
    CheckPaste(List, Host.Get(), Parent, Skip, NewTestForm);
  }
  return 0;
}
