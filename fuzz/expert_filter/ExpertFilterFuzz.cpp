//===- fuzz/expert_filter/ExpertFilterFuzz.cpp - Templates from the fuzzer -===//
//
// Filters arbitrary bytes as a template against a fixed set of properties and
// collections. A run may end in the filter's own error and nothing else; after
// it no collection may still point at a loop, and nothing may leak. The first
// line also goes through the reserved-word tables.
//
//===----------------------------------------------------------------------===//
#include "tools/CppSym.h"
#include "tools/ExpertFilterClasses.h"
#include "tools/PasSym.h"

#include "platform/TypInfoBuilder.h"

#include <cstdint>
#include <vector>

using namespace formkit;

namespace {

/// Lines of a text held in memory, split the way template files are.
class TMemoryLines : public TInterfacedObject, public ILineProvider {
  FK_CLASS(TMemoryLines, TInterfacedObject)
  FK_INTERFACES(ILineProvider)

  explicit TMemoryLines(std::string_view Text = {}) : FText(Text) {}

  bool HasMore() override { return FPos < FText.size(); }
  String NextLine() override {
    std::size_t End = FText.find_first_of("\r\n", FPos);
    if (End == std::string_view::npos) End = FText.size();
    String Line(FText.substr(FPos, End - FPos));
    FPos = End + ((End + 1 < FText.size() && FText[End] == '\r' && FText[End + 1] == '\n') ? 2 : 1);
    ++FLine;
    return Line;
  }
  int LineNumber() override { return FLine; }
  bool Restart() override { return false; }
  void Cleanup() override {}
  bool IsOutputOn() override { return true; }

private:
  std::string_view FText;
  std::size_t FPos = 0;
  int FLine = 0;
};

IPtr<IPropertyValues> Item(const char* Name, int Value) {
  IPtr<IPropertyValues> Result = CoPropertyValues::Create();
  Result->SetProperty("name", Name);
  Result->SetProperty("x", Value);
  return Result;
}

} // namespace

FK_IMPLEMENT(TMemoryLines, "ExpertFilterFuzz") {}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  std::string_view Text(reinterpret_cast<const char*>(Data), Size);

  // Each loop multiplies the lines of the loops inside it: keep the work bounded.
  int Loops = 0;
  for (std::size_t P = Text.find("foreach"); P != std::string_view::npos; P = Text.find("foreach", P + 1))
    if (++Loops > 6) return 0;

  IPtr<ICollectionProperty> Children = CoCollectionProperty::Create();
  Children->AddItem(Item("child", 9));
  IPtr<ICollectionProperty> Items = CoCollectionProperty::Create();
  Items->AddItem(Item("one", 1));
  Items->AddItem(Item("two", 2));
  Items->GetItem(1)->SetCollectionProperty("children", Children);
  IPtr<ICollectionProperty> None = CoCollectionProperty::Create();

  IPtr<IExpertFilter> Filter = CoExpertFilter::Create();
  Filter->SetProperty("Name", "Main");
  Filter->SetProperty("Flag", true);
  Filter->SetProperty("Count", 3);
  Filter->SetCollectionProperty("items", Items);
  Filter->SetCollectionProperty("none", None);
  try {
    String Out = Filter->Filter(New<TMemoryLines>(Text));
    if (!Out.empty() && (Out.size() < 2 || Out.compare(Out.size() - 2, 2, "\r\n") != 0)) __builtin_trap();
  } catch (const EExpertFilterError&) {
  }
  if (Items->GetCurrentItem() || Children->GetCurrentItem() || None->GetCurrentItem()) __builtin_trap();

  std::string_view First = Text.substr(0, Text.find('\n'));
  PasSym::IsReservedWord(First);
  CppSym::IsReservedWord(First);
  if (SymbolIndex(First) != SymbolIndex(detail::CaseFold(First)) && First.size() <= 255) {
    // Folding keeps the bucket of text that is already valid UTF-8 and unchanged by cutting.
    bool Valid = Utf16ToUtf8(Utf8ToUtf16(First)) == First;
    if (Valid) __builtin_trap();
  }
  return 0;
}
