//===- fuzz/form_reader/FormReaderFuzz.cpp - Fuzzing the form reader ------===//
//
// Feeds each input to every reader of form data: a root read, the binary to text
// conversion and the text to binary conversion. Bad input must end in
// `EReadError`; anything else (a crash, a leak, another exception) is a finding.
// Whatever reads successfully must also convert back exactly.
//
// Example:
//   build/test/fuzz/form_reader/fk_fuzz_form_reader -runs=20000 scratch/ corpus/
//
//===----------------------------------------------------------------------===//
#include "tests/platform/StreamingFixtures.h"

#include <cstdlib>
#include <cstring>

using namespace formkit;
using namespace formkit::streamtest;

namespace {

void Require(bool Condition) {
  if (!Condition) std::abort();
}

std::vector<std::uint8_t> Bytes(TMemoryStream* S) { return BytesOf(S); }

/// A root read; what was read writes and reads again.
void ReadAsRoot(const std::uint8_t* Data, std::size_t Size) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  if (TestStreamFormat(In.Get()) == sofBinary && Size > 0 && Data[0] == 0xFF) {
    try {
      In->ReadResHeader();
    } catch (const EReadError&) {
      return;
    }
  }
  TObjectGuard<TReader> R(new TReader(In.Get(), 256));
  TObjectGuard<TComponent> Root(CreateComponent(TTestForm::StaticClass(), nullptr));
  try {
    R->ReadRootComponent(Root.Get());
  } catch (const EReadError&) {
    return;
  }
  std::vector<std::uint8_t> Written = WriteBytes(Root.Get());
  TObjectGuard<TComponent> Again(ReadBytes(Written));
  Require(WriteBytes(Again.Get()) == Written);
}

/// Binary to text; the text converts back to data that gives the same text.
void BinaryToTextAndBack(const std::uint8_t* Data, std::size_t Size) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  try {
    ObjectBinaryToText(In.Get(), Text.Get());
  } catch (const EReadError&) {
    return;
  }
  Text->SetPosition(0);
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  ObjectTextToBinary(Text.Get(), Bin.Get());
  Bin->SetPosition(0);
  TObjectGuard<TMemoryStream> Text2(new TMemoryStream);
  ObjectBinaryToText(Bin.Get(), Text2.Get());
  Require(Bytes(Text.Get()) == Bytes(Text2.Get()));
}

/// Text to binary; the data converts to text that gives the same data.
void TextToBinaryAndBack(const std::uint8_t* Data, std::size_t Size) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  try {
    ObjectTextToBinary(In.Get(), Bin.Get());
  } catch (const EReadError&) {
    Require(In->Position() == 0 && Bin->Size() == 0);
    return;
  }
  Bin->SetPosition(0);
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  ObjectBinaryToText(Bin.Get(), Text.Get());
  Text->SetPosition(0);
  TObjectGuard<TMemoryStream> Bin2(new TMemoryStream);
  ObjectTextToBinary(Text.Get(), Bin2.Get());
  Require(Bytes(Bin.Get()) == Bytes(Bin2.Get()));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  static const bool Registered = (RegisterStreamingClasses(), true);
  (void)Registered;
  ReadAsRoot(Data, Size);
  BinaryToTextAndBack(Data, Size);
  TextToBinaryAndBack(Data, Size);
  return 0;
}
