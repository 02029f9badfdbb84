//===- fuzz/support/MakeSeeds.cpp - Seeds of the fuzz targets -------------===//
//
// Builds real modules in code and saves them, binary, as text and behind a
// resource header, into the corpus folders of the fuzz targets; and writes the
// templates whose loops nest up to and past the template filter's limit. Every
// module is checked first: it converts exactly and reads back to the same bytes.
// Files of the same name are replaced; others are left alone.
//
// Example (from the top of the source tree, after building the test preset):
//   build/test/fuzz/support/fk_make_fuzz_seeds fuzz
//
//===----------------------------------------------------------------------===//
#include "fuzz/support/KilnSamples.h"
#include "tests/platform/StreamingFixtures.h"

#include "tools/ExpertFilterClasses.h"

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>

using namespace formkit;
using namespace formkit::fuzzing;

namespace {

namespace fs = std::filesystem;

/// Writes the seeds of one target's corpus folder.
class TCorpus {
public:
  TCorpus(const fs::path& FuzzDir, const char* Target) : FDir(FuzzDir / Target / "corpus") {
    fs::create_directories(FDir);
  }

  void Save(const char* Name, std::string_view Bytes) const {
    std::ofstream Out(FDir / Name, std::ios::binary | std::ios::trunc);
    Out.write(Bytes.data(), static_cast<std::streamsize>(Bytes.size()));
    if (!Out) Finding("a seed file cannot be written");
    std::printf("%8zu  %s\n", Bytes.size(), (FDir / Name).c_str());
  }
  void Save(const char* Name, const TBytes& Bytes) const {
    Save(Name, std::string_view(reinterpret_cast<const char*>(Bytes.data()), Bytes.size()));
  }
  /// A module as binary data ("<stem>.bin"), as text ("<stem>.txt") and, when `Resource`,
  /// behind a resource header ("<stem>.res").
  void SaveModule(const char* Stem, const TBytes& Data, bool Resource = true) const {
    String Text = DataToText(Data);
    Save((String(Stem) + ".bin").c_str(), Data);
    Save((String(Stem) + ".txt").c_str(), Text);
    if (Resource) Save((String(Stem) + ".res").c_str(), TextToResource(Text));
  }

private:
  fs::path FDir;
};

/// `Data` cut short right after the last `Name`: a file whose end is lost, there in the
/// middle of a property.
TBytes CutAfter(const TBytes& Data, std::string_view Name) {
  auto It = std::find_end(Data.begin(), Data.end(), Name.begin(), Name.end());
  if (It == Data.end()) Finding("the place to cut a seed is missing");
  return TBytes(Data.begin(), It + static_cast<std::ptrdiff_t>(Name.size()));
}

/// A descendant `Text` cut short (see `CutAfter`), which must then fail to read over a root
/// that `NewDescendant` makes.
TBytes CutDescendant(const String& Text, std::string_view Name, const TNewRoot& NewDescendant) {
  TBytes Cut = CutAfter(TextToData(Text), Name);
  try {
    TObjectGuard<TComponent> Read(ReadRoot(Cut, NewDescendant));
  } catch (const EReadError&) {
    return Cut;
  }
  Finding("a descendant cut short reads");
}

/// The text of the components `Names` of `Root`, one after the other.
String ComponentsText(TComponent* Root, std::initializer_list<const char*> Names) {
  String Text;
  for (const char* Name : Names) Text += DataToText(WriteComponents(Root, {Name}));
  return Text;
}

/// The streaming test family: the rich form, a descendant of it, a paste.
void FormReaderSeeds(const fs::path& FuzzDir) {
  using namespace formkit::streamtest;
  TCorpus Corpus(FuzzDir, "form_reader");
  auto NewForm = [] { return CreateComponent(TTestForm::StaticClass(), nullptr); };
  TObjectGuard<TTestForm> Rich(BuildRichForm());
  TBytes RichData = CheckRoundTrip(Rich.Get(), NewForm);
  Corpus.SaveModule("rich_form", RichData);

  auto NewDescendant = [&] { return ReadRoot(RichData, NewForm); };
  TObjectGuard<TComponent> Descendant(NewDescendant());
  auto* Panel = static_cast<TTestControl*>(Descendant->FindComponent("Panel1"));
  Panel->Left = 24;
  auto* Box = AddControl(Descendant.Get(), static_cast<TTestControl*>(Descendant.Get()), "Box1");
  AddControl(Descendant.Get(), Box, "Box2")->Caption = "inside";
  static_cast<TTestControl*>(Descendant->FindComponent("Button2"))->SetParentComponent(Box);
  Box->Buddy = Descendant->FindComponent("Button1");
  static_cast<TTestControl*>(Descendant.Get())->Rows->Add();
  Corpus.SaveModule("rich_descendant", CheckRoundTrip(Descendant.Get(), NewDescendant, Rich.Get()), false);

  // An inherited control moved into a new one, and the file cut short inside that: the
  // read fails after it moved the control.
  const char* Moved = "inherited Form1: TTestForm\n"
                      "  object Box1: TTestControl\n"
                      "    Left = 8\n"
                      "    inherited Button2: TTestControl\n"
                      "      Top = 4\n"
                      "    end\n"
                      "    object Box2: TTestControl\n"
                      "      Caption = \"cut here\"\n"
                      "    end\n"
                      "  end\n"
                      "end\n";
  Corpus.Save("rich_moved_cut.bin", CutDescendant(Moved, "Caption", NewDescendant));

  Corpus.Save("rich_paste.bin", WriteComponents(Rich.Get(), {"Panel1", "Ticker1"}));
  Corpus.Save("rich_paste.txt", ComponentsText(Rich.Get(), {"Panel1", "Ticker1"}));
}

/// Kiln modules: forms, a descendant, a frame inline and on its own, a data module, a paste.
void KilnSeeds(const fs::path& FuzzDir) {
  TCorpus Corpus(FuzzDir, "kiln_forms");
  TObjectGuard<TSampleForm> A(BuildModuleA());
  Corpus.SaveModule("module_a", CheckRoundTrip(A.Get(), NewSampleForm));
  Corpus.Save("paste.bin", WriteComponents(A.Get(), {"Panel1", "Label1", "Timer1", "LinkPanel1"}));
  Corpus.Save("paste.txt", ComponentsText(A.Get(), {"Panel1", "Label1", "Timer1", "LinkPanel1"}));

  TObjectGuard<TSampleForm> Ancestor(BuildAncestor());
  TBytes AncestorData = CheckRoundTrip(Ancestor.Get(), NewSampleForm);
  Corpus.SaveModule("ancestor", AncestorData, false);
  TObjectGuard<TSampleForm> Descendant(BuildDescendant(AncestorData));
  auto NewDescendant = [&] { return NewDescendantRoot(AncestorData); };
  Corpus.SaveModule("descendant", CheckRoundTrip(Descendant.Get(), NewDescendant, Ancestor.Get()));
  // An inherited edit moved into a new panel, and the file cut short inside that panel.
  const char* Moved = "inherited Form1: TSampleForm\n"
                      "  object Panel2: TPanel\n"
                      "    Left = 220\n"
                      "    Top = 8\n"
                      "    inherited Edit1: TEdit\n"
                      "      Left = 4\n"
                      "      Top = 4\n"
                      "    end\n"
                      "    object CheckBox1: TCheckBox\n"
                      "      Checked = True\n"
                      "    end\n"
                      "  end\n"
                      "end\n";
  Corpus.Save("descendant_moved_cut.bin", CutDescendant(Moved, "Checked", NewDescendant));

  TObjectGuard<TSampleFrame> Frame(BuildFrame());
  Corpus.SaveModule("frame", CheckRoundTrip(Frame.Get(), NewSampleFrame), false);
  TObjectGuard<TSampleForm> WithFrame(BuildFormWithFrame());
  Corpus.SaveModule("form_with_frame", CheckRoundTrip(WithFrame.Get(), NewSampleForm), false);
  TObjectGuard<TSampleDataModule> Data(BuildDataModule());
  Corpus.SaveModule("data_module", CheckRoundTrip(Data.Get(), NewSampleDataModule), false);
}

/// Module B, whose references name components of module A: read while A is open.
void FixupSeeds(const fs::path& FuzzDir) {
  TCorpus Corpus(FuzzDir, "module_fixups");
  TObjectGuard<TSampleForm> A(BuildModuleA());
  int Token = RegisterFindGlobalComponentProc(
      [&](const String& Name) -> TComponent* { return SameText(Name, A->Name()) ? A.Get() : nullptr; });
  TObjectGuard<TSampleForm> B(BuildModuleB(A.Get()));
  TBytes BData = CheckRoundTrip(B.Get(), NewSampleForm);
  UnregisterFindGlobalComponentProc(Token);
  Corpus.SaveModule("module_b", BData);
  Corpus.SaveModule("module_a", WriteRoot(A.Get()), false);
}

/// `Line` `Count` times, each on a line of its own or all on one line.
String Repeat(std::string_view Line, int Count, bool OneLine) {
  String Text;
  for (int I = 0; I < Count; ++I) {
    Text += Line;
    if (!OneLine) Text += '\n';
  }
  return Text;
}

/// Loops nested `Depth` deep over the one-item collection.
String NestedLoops(int Depth) {
  return Repeat("[!foreach(deep)]", Depth, false) + "[!deep.name] [!deep.x] [!Name]\n" +
         Repeat("[!endforeach]", Depth, false);
}

/// UTF-16 with its byte order mark; the text is ASCII.
String Utf16(std::string_view Text, bool BigEndian) {
  String Out = BigEndian ? "\xFE\xFF" : "\xFF\xFE";
  for (char C : Text) {
    Out += BigEndian ? '\0' : C;
    Out += BigEndian ? C : '\0';
  }
  return Out;
}

/// Templates of the template filter: loops at and past the nesting limit, byte order marks.
void ExpertFilterSeeds(const fs::path& FuzzDir) {
  TCorpus Corpus(FuzzDir, "expert_filter");
  // The file is a provider too: that many loops inside it reach the limit, one more fails.
  Corpus.Save("loops_at_limit.tpl", NestedLoops(TExpertFilter::MaxLoopDepth));
  Corpus.Save("loops_past_limit.tpl", NestedLoops(TExpertFilter::MaxLoopDepth + 1));
  Corpus.Save("loops_on_one_line.tpl", Repeat("[!foreach(deep)]", TExpertFilter::MaxLoopDepth + 2, true) + "x\n");
  Corpus.Save("loops_after_end.tpl", "[!foreach(deep)]\n" + Repeat("[!endforeach][!foreach(deep)]", 3, false) +
                                         "[!endforeach]\n[!foreach(none)][!endforeach][!foreach(items)]\n"
                                         "[!items.name][!endforeach][!endforeach]\n");
  const char* Sample = "unit [!Name];\r\n[!foreach(i in items)]\r\n  [!i.name] = [!i.x];\r\n[!endforeach]\r\n";
  Corpus.Save("utf8_mark.tpl", String("\xEF\xBB\xBF") + Sample);
  Corpus.Save("utf16_le.tpl", Utf16(Sample, false));
  Corpus.Save("utf16_be.tpl", Utf16(Sample, true));
}

} // namespace

int main(int Argc, char** Argv) {
  if (Argc != 2) {
    std::fprintf(stderr, "usage: %s <fuzz folder>\n", Argv[0]);
    return 2;
  }
  fs::path FuzzDir = Argv[1];
  streamtest::RegisterStreamingClasses();
  StartKilnSamples();
  try {
    FormReaderSeeds(FuzzDir);
    KilnSeeds(FuzzDir);
    FixupSeeds(FuzzDir);
    ExpertFilterSeeds(FuzzDir);
  } catch (const Exception& E) {
    std::fprintf(stderr, "%s: %s\n", E.ClassName(), E.Message().c_str());
    return 1;
  }
  ProcessMessages();
  return 0;
}
