//===- tests/frameworks/kiln/design/KilnDesignFixture.cpp - Class records and helpers of the fixture ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "platform/Filer.h"

namespace formkit::fakes {

FK_IMPLEMENT(TToolItem, "Tests") {}

String FormImage(TComponent* Root, TComponent* Ancestor) {
  TObjectGuard<TMemoryStream> Data(new TMemoryStream);
  {
    TObjectGuard<TWriter> Writer(new TWriter(Data.Get(), 4096));
    Writer->WriteDescendent(Root, Ancestor);
  }
  Data->SetPosition(0);
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  ObjectBinaryToText(Data.Get(), Text.Get());
  return String(reinterpret_cast<const char*>(Text->Memory()), static_cast<size_t>(Text->Size()));
}

} // namespace formkit::fakes
