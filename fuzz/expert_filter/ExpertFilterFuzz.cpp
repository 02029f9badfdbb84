//===- fuzz/expert_filter/ExpertFilterFuzz.cpp - Templates from the fuzzer -===//
//
// Filters arbitrary bytes as a template against a fixed set of properties and
// collections, twice: from a file (written to a directory of the run's own,
// sometimes as the variant of a language, so that the file provider finds it,
// takes off its byte order mark and splits its lines) and from lines held in
// memory. A run may end in the filter's own error and nothing else; both runs
// must give the same text or the same error (the file's run naming the file);
// after them no collection may still point at a loop, and nothing may leak. The
// first line also goes through the reserved-word tables.
//
// Loops over a collection of one item or none ("deep", "none") cost one pass
// each, so they may nest as deep as the input likes, past the filter's limit.
// Loops over anything else multiply the lines of the loops inside them, so only
// a few of those are run.
//
// Example:
//   build/test/fuzz/expert_filter/fk_fuzz_expert_filter -runs=20000 scratch/ corpus/
//
//===----------------------------------------------------------------------===//
#include "tools/CppSym.h"
#include "tools/ExpertFilterClasses.h"
#include "tools/PasSym.h"

#include "platform/TypInfoBuilder.h"

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <system_error>
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

/// The language whose variants of templates some runs use.
constexpr const char* Language = "xx";
constexpr const char* TemplateName = "template.tpl";
/// Loops over collections of more than one item that one input may hold.
constexpr int MaxCostlyLoops = 8;

/// A directory of one run's own, removed with the run: the template's file goes there.
class TScratchDir {
public:
  TScratchDir() {
    char Pattern[] = "/tmp/fk-expert-filter-XXXXXX";
    if (!mkdtemp(Pattern)) std::abort();
    FPath = Pattern;
  }
  ~TScratchDir() {
    std::error_code Ec;
    std::filesystem::remove_all(FPath, Ec);
  }
  TScratchDir(const TScratchDir&) = delete;
  TScratchDir& operator=(const TScratchDir&) = delete;

  /// Writes the template where the filter will look for it: in the language's folder or
  /// beside it.
  void WriteTemplate(std::string_view Text, bool AsVariant) const {
    std::filesystem::path Dir = AsVariant ? FPath / Language : FPath;
    std::filesystem::create_directories(Dir);
    std::ofstream Out(Dir / TemplateName, std::ios::binary | std::ios::trunc);
    Out.write(Text.data(), static_cast<std::streamsize>(Text.size()));
    if (!Out) std::abort();
  }
  /// The directory as the filter takes it: with its separator.
  String Directory() const { return FPath.string() + "/"; }

private:
  std::filesystem::path FPath;
};

std::size_t CountOf(std::string_view Text, std::string_view Word, bool IgnoreCase) {
  std::size_t N = 0;
  for (std::size_t P = 0; P + Word.size() <= Text.size(); ++P)
    if (IgnoreCase ? SameText(Text.substr(P, Word.size()), Word) : Text.substr(P, Word.size()) == Word) ++N;
  return N;
}

/// Whether the loops of `Text` are cheap enough to run: every loop tag is over "deep" or
/// "none", except at most a few. No tag of the text can make those two hold more items:
/// they are named nowhere else but in reads through their current item ("deep.x").
bool LoopsAreBounded(std::string_view Text) {
  // Only a tag that starts with "foreach" opens a loop; "endforeach" closes one.
  auto Opening = [&](const String& Word) {
    return static_cast<long>(CountOf(Text, Word, false)) - static_cast<long>(CountOf(Text, "end" + Word, false));
  };
  long Costly = Opening("foreach");
  for (const char* Key : {"deep", "none"}) {
    String Tag = String("foreach(") + Key + ")";
    String Read = String(Key) + ".";
    if (CountOf(Text, Tag, false) + CountOf(Text, Read, true) == CountOf(Text, Key, true)) Costly -= Opening(Tag);
  }
  return Costly <= MaxCostlyLoops;
}

IPtr<IPropertyValues> Item(const char* Name, int Value) {
  IPtr<IPropertyValues> Result = CoPropertyValues::Create();
  Result->SetProperty("name", Name);
  Result->SetProperty("x", Value);
  return Result;
}

/// The outcome of one run: the text, or the error's message after the template's name.
struct TRun {
  bool Failed = false;
  String Text;
};

/// One run over `Provider`, or the template file in `Directory` when it is null, with
/// fresh properties.
TRun FilterOnce(const IPtr<ILineProvider>& Provider, const String& Directory = {}) {
  IPtr<ICollectionProperty> Children = CoCollectionProperty::Create();
  Children->AddItem(Item("child", 9));
  IPtr<ICollectionProperty> Items = CoCollectionProperty::Create();
  Items->AddItem(Item("one", 1));
  Items->AddItem(Item("two", 2));
  Items->GetItem(1)->SetCollectionProperty("children", Children);
  IPtr<ICollectionProperty> None = CoCollectionProperty::Create();
  IPtr<ICollectionProperty> Deep = CoCollectionProperty::Create();
  Deep->AddItem(Item("level", 0));

  IPtr<IExpertFilter> Filter = CoExpertFilter::Create();
  Filter->SetProperty("Name", "Main");
  Filter->SetProperty("Flag", true);
  Filter->SetProperty("Count", 3);
  Filter->SetCollectionProperty("items", Items);
  Filter->SetCollectionProperty("none", None);
  Filter->SetCollectionProperty("deep", Deep);
  TRun Run;
  try {
    Run.Text = Provider ? Filter->Filter(Provider) : Filter->Filter(TemplateName, Directory);
    if (!Run.Text.empty() && (Run.Text.size() < 2 || Run.Text.compare(Run.Text.size() - 2, 2, "\r\n") != 0))
      __builtin_trap();
  } catch (const EExpertFilterError& E) {
    // "name(line): message": the name is the file's, or empty for lines from memory.
    String Prefix = Provider ? "(" : String(TemplateName) + "(";
    if (E.Message().compare(0, Prefix.size(), Prefix) != 0) __builtin_trap();
    Run.Failed = true;
    Run.Text = E.Message().substr(Prefix.size());
  }
  for (const auto& C : {Items, Children, None, Deep})
    if (C->GetCurrentItem()) __builtin_trap();
  return Run;
}

void CheckSymbols(std::string_view Text) {
  std::string_view First = Text.substr(0, Text.find('\n'));
  PasSym::IsReservedWord(First);
  CppSym::IsReservedWord(First);
  if (SymbolIndex(First) != SymbolIndex(detail::CaseFold(First)) && First.size() <= 255) {
    // Folding keeps the bucket of text that is already valid UTF-8 and unchanged by cutting.
    bool Valid = Utf16ToUtf8(Utf8ToUtf16(First)) == First;
    if (Valid) __builtin_trap();
  }
}

bool StartsWith(std::string_view Text, std::string_view Mark) { return Text.substr(0, Mark.size()) == Mark; }

} // namespace

FK_IMPLEMENT(TMemoryLines, "ExpertFilterFuzz") {}

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  // The reserved-word tables live as long as their units: here, the process.
  InitializePasSym();
  InitializeCppSym();
  detail::SetLocaleLanguage(Language);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  std::string_view Text(reinterpret_cast<const char*>(Data), Size);
  CheckSymbols(Text);
  if (!LoopsAreBounded(Text)) return 0;

  TRun FromFile;
  {
    TScratchDir Dir;
    Dir.WriteTemplate(Text, Size % 2 == 1);
    FromFile = FilterOnce(nullptr, Dir.Directory());
  }

  // The same lines from memory, where a file's UTF-8 mark is no part of the text; text
  // behind a UTF-16 mark is decoded first, so it has no twin here.
  if (StartsWith(Text, "\xFF\xFE") || StartsWith(Text, "\xFE\xFF")) return 0;
  if (StartsWith(Text, "\xEF\xBB\xBF")) Text.remove_prefix(3);
  TRun FromMemory = FilterOnce(New<TMemoryLines>(Text));
  if (FromFile.Failed != FromMemory.Failed || FromFile.Text != FromMemory.Text) __builtin_trap();
  return 0;
}
