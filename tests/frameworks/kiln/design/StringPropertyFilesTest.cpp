//===- tests/frameworks/kiln/design/StringPropertyFilesTest.cpp - String lists as virtual files ===//
//
// The strings file system over real Kiln modules and a recording host: a
// memo's lines opened as a virtual file, read, written back, the file's age,
// the messages of names that do not resolve, and the entry kept in step with
// renames, saves and the component's end.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnMemo.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"
#include "tests/frameworks/kiln/design/StringsHost.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A component whose list property may hold no list.
class TListHolder : public TComponent {
  FK_CLASS(TListHolder, TComponent)
  TStrings* Items() const noexcept { return FItems; }
  void SetItems(TStrings* Value) { FItems->Assign(Value); }

private:
  TStrings* FItems = nullptr;
};
FK_IMPLEMENT(TListHolder, "StringPropertyFiles") { B.Property("Items", &TListHolder::Items, &TListHolder::SetItems); }

constexpr const char* LinesFile = "Kiln.Form1.Memo1.Lines";
constexpr int ReadMode = fmOpenRead | fmShareDenyNone;

struct StringPropertyFiles : KilnDesignFixture {
  IPtr<TStringsHostServices> Host;
  IPtr<IRoot> Form;
  IPtr<TRecordingModule> FormRecord;
  IPtr<TStringsHostModule> FormModule;
  TMemo* Memo = nullptr;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Host = New<TStringsHostServices>(&Log);
    HalvernIDEServices = IPtr<IHalvernIDEServices>(Host.Get());
    RegisterStringsFileSystem();
    Form = NewForm("Form1", &FormRecord);
    Memo = CreateComponentOf<TMemo>(Form->GetRoot());
    Memo->SetName("Memo1");
    Memo->Lines()->SetText("one\ntwo\n");
    FormModule = Host->AddFormModule("Form1", Form->GetDesigner());
    Log.Clear();
  }
  void TearDown() override {
    UnregisterStringsFileSystem();
    FormModule = nullptr;
    KilnDesignFixture::TearDown();
    HalvernIDEServices = nullptr;
    Host = nullptr;
  }

  TStringsFileSystem* Files() { return StringsFileSystem(); }
  /// The whole content of a stream, from where it stands.
  static String ReadAll(const IPtr<IStream>& Stream) {
    String Text;
    char Chunk[64];
    while (std::int64_t Read = Stream->Read(Chunk, sizeof Chunk)) Text.append(Chunk, static_cast<size_t>(Read));
    return Text;
  }
  /// Writes `Text` as the code editor saves a file: a new stream, written, let go.
  void SaveFile(const String& Name, const String& Text) {
    IPtr<IStream> Stream = Files()->GetFileStream(Name, fmCreate);
    ASSERT_EQ(Stream->Write(Text.data(), static_cast<std::int64_t>(Text.size())),
              static_cast<std::int64_t>(Text.size()));
  }
  /// The host opens the virtual file in its code editor.
  IPtr<TStringsHostModule> OpenTextModule(const String& Name = LinesFile) {
    auto Module = New<TStringsHostModule>(Host.Get(), Name, StringsFileSystemID, &Log);
    Host->Modules.push_back(Module);
    Module->Load();
    return Module;
  }
  /// The message of the `ENonAIRException` that opening `Name` raises.
  String OpenError(const String& Name) {
    try {
      (void)Files()->GetFileStream(Name, ReadMode);
    } catch (const ENonAIRException& E) {
      return E.Message();
    }
    return "no error";
  }
};

//===----------------------------------------------------------------------===//
// Reading and writing
//===----------------------------------------------------------------------===//

TEST_F(StringPropertyFiles, APropertyOpensEditsAndSavesBackModifyingTheModuleOnce) {
  ASSERT_TRUE(Files());
  EXPECT_TRUE(Files()->FileExists(LinesFile));
  // Only the name part of a path counts.
  EXPECT_EQ(ReadAll(Files()->GetFileStream(String("/virtual/dir/") + LinesFile, ReadMode)), "one\r\ntwo\r\n");
  ASSERT_EQ(Files()->Count(), 1);
  EXPECT_EQ(Files()->FileName(0), LinesFile);

  // Reading and closing without writing changes nothing.
  EXPECT_EQ(Log.Count("Modified"), 0);
  EXPECT_EQ(Files()->FileAge(LinesFile), 0);

  // A zero-length write is no write.
  {
    IPtr<IStream> Stream = Files()->GetFileStream(LinesFile, fmCreate);
    EXPECT_EQ(Stream->Write("", 0), 0);
  }
  EXPECT_EQ(Memo->Lines()->CommaText(), "one,two");
  EXPECT_EQ(Log.Count("Modified"), 0);

  // Text with non-ASCII characters goes in and comes out as UTF-8.
  SaveFile(LinesFile, "Grüße\r\nÆble ✓");
  EXPECT_EQ(Memo->Lines()->Count(), 2);
  EXPECT_EQ(Memo->Lines()->Get(0), "Grüße");
  EXPECT_EQ(Memo->Lines()->Get(1), "Æble ✓");
  EXPECT_EQ(Log.Count("Modified"), 1) << Log.Text();
  EXPECT_EQ(ReadAll(Files()->GetFileStream(LinesFile, ReadMode)), "Grüße\r\nÆble ✓\r\n");
  EXPECT_EQ(Log.Count("Modified"), 1);
  // One entry for the name, however often it is opened.
  EXPECT_EQ(Files()->Count(), 1);
}

TEST_F(StringPropertyFiles, TheFileAgeFollowsTheEdit) {
  EXPECT_EQ(Files()->FileAge(LinesFile), -1); // never opened
  IPtr<IStream> Reading = Files()->GetFileStream(LinesFile, ReadMode);
  EXPECT_EQ(QueryAs<IOTAStreamModifyTime>(Reading)->GetModifyTime(), 0);
  Reading = nullptr;
  EXPECT_EQ(Files()->FileAge(LinesFile), 0);

  int Before = DateTimeToFileDate(Now());
  SaveFile(LinesFile, "changed");
  int After = DateTimeToFileDate(Now());
  int Age = Files()->FileAge(LinesFile);
  EXPECT_GE(Age, Before);
  EXPECT_LE(Age, After);
  // A stream opened later starts at the stored age.
  EXPECT_EQ(QueryAs<IOTAStreamModifyTime>(Files()->GetFileStream(LinesFile, ReadMode))->GetModifyTime(), Age);

}

TEST_F(StringPropertyFiles, NamesThatDoNotResolveRaiseTheFileSystemsMessages) {
  EXPECT_EQ(OpenError("Kiln.Form7.Memo1.Lines"), "Unable to locate form/component, 'Kiln.Form7.Memo1.Lines'");
  EXPECT_EQ(OpenError("/dir/Skein.Form1.Memo1.Lines"), "Unable to locate form/component, 'Skein.Form1.Memo1.Lines'");
  EXPECT_EQ(OpenError("Kiln.Form1.Memo9.Lines"), "Unable to locate form/component, 'Kiln.Form1.Memo9.Lines'");
  EXPECT_EQ(OpenError("Kiln.Form1"), "Unable to locate form/component, 'Kiln.Form1'");
  EXPECT_EQ(OpenError("Kiln.Form1.Memo1.Items"), "Unable to locate property 'Items' on component 'Memo1'");
  EXPECT_EQ(OpenError("Kiln.Form1.Memo1.Width"), "Unable to locate property 'Width' on component 'Memo1'");
  auto* Holder = CreateComponentOf<TListHolder>(Form->GetRoot());
  Holder->SetName("Holder1");
  EXPECT_EQ(OpenError("Kiln.Form1.Holder1.Items"), "Property 'Items' has not been initialized on component 'Holder1'");
  // Nothing is left behind by a failure.
  EXPECT_EQ(Files()->Count(), 0);
  EXPECT_EQ(Files()->FileAge("Kiln.Form1.Memo1.Items"), -1);
  EXPECT_FALSE(Files()->FileExists("Kiln.Form7.Memo1.Lines"));
  EXPECT_TRUE(Files()->FileExists("Kiln.Form1.Holder1.Items")); // the component resolves
}

TEST_F(StringPropertyFiles, AModuleNotOpenIsAskedForByName) {
  Env->OnOpenModuleByName = [this](const String& Name) {
    IPtr<IRoot> Other = NewForm(Name);
    auto* M = CreateComponentOf<TMemo>(Other->GetRoot());
    M->SetName("Notes");
    M->Lines()->Add("from " + Name);
  };
  EXPECT_EQ(ReadAll(Files()->GetFileStream("Kiln.Form2.Notes.Lines", ReadMode)), "from Form2\r\n");
  EXPECT_EQ(Log.Count("OpenModuleByName(Form2)"), 1);
  // Open now: not asked again.
  EXPECT_TRUE(Files()->FileExists("Kiln.Form2.Notes.Lines"));
  EXPECT_EQ(Log.Count("OpenModuleByName(Form2)"), 1);
}

//===----------------------------------------------------------------------===//
// Keeping the file in step
//===----------------------------------------------------------------------===//

TEST_F(StringPropertyFiles, RenamesOfTheComponentAndTheRootRenameTheFile) {
  IPtr<TStringsHostModule> Text = OpenTextModule();
  EXPECT_EQ(Text->Buffer, "one\r\ntwo\r\n");
  EXPECT_EQ(Text->LiveNotifiers(), 1);
  EXPECT_EQ(FormModule->Editor->LiveNotifiers(), 1);

  Memo->SetName("Memo2");
  FormModule->Editor->FireRenamed(Memo, "Memo1", "Memo2");
  EXPECT_EQ(Files()->FileName(0), "Kiln.Form1.Memo2.Lines");
  EXPECT_EQ(Text->FileName, "Kiln.Form1.Memo2.Lines");

  Form->GetRoot()->SetName("Main");
  FormModule->Editor->FireRenamed(Form->GetRoot(), "Form1", "Main");
  EXPECT_EQ(Files()->FileName(0), "Kiln.Main.Memo2.Lines");

  FormModule->Editor->FireRenamed(nullptr, "Button1", "Button2"); // anything else
  EXPECT_EQ(Files()->FileName(0), "Kiln.Main.Memo2.Lines");
  EXPECT_EQ(Log.Count("SetFileName"), 2);

  // The host saves the module under the new name: the text reaches the property.
  Text->Buffer = "renamed";
  ASSERT_TRUE(Text->Save(false, false));
  EXPECT_EQ(Memo->Lines()->CommaText(), "renamed");
}

TEST_F(StringPropertyFiles, SavingTheFormSavesTheFileFirst) {
  IPtr<TStringsHostModule> Text = OpenTextModule();
  Text->Buffer = "typed\r\nin the editor";
  FormModule->Editor->FireSaving();
  EXPECT_EQ(Log.Count("Save(Kiln.Form1.Memo1.Lines)"), 1);
  EXPECT_EQ(Memo->Lines()->CommaText(), "typed,\"in the editor\"");
  EXPECT_EQ(Log.Count("Modified"), 1);
}

TEST_F(StringPropertyFiles, AModuleSavedUnderARealNameLeavesTheFileSystem) {
  IPtr<TStringsHostModule> Text = OpenTextModule();
  Text->SaveAs(LinesFile); // the same name: stays
  EXPECT_EQ(Files()->Count(), 1);
  Text->SaveAs("/home/user/lines.txt");
  EXPECT_EQ(Files()->Count(), 0);
  EXPECT_EQ(Log.Count("SetFileSystem()"), 1);
  EXPECT_EQ(Text->LiveNotifiers(), 0);
  EXPECT_EQ(FormModule->Editor->LiveNotifiers(), 0);
  EXPECT_EQ(Files()->FileAge(LinesFile), -1);
}

TEST_F(StringPropertyFiles, TheComponentsEndClosesTheFile) {
  IPtr<TStringsHostModule> Text = OpenTextModule();
  // Names compare without regard to case: the same entry.
  EXPECT_EQ(Files()->FileAge("Kiln.FORM1.memo1.lines"), 0);
  EXPECT_EQ(Files()->Count(), 1);
  Memo->Destroy();
  Memo = nullptr;
  EXPECT_EQ(Log.Count("CloseModule(force)"), 1);
  EXPECT_EQ(Files()->Count(), 0);
  EXPECT_EQ(Text->LiveNotifiers(), 0);
  EXPECT_EQ(FormModule->Editor->LiveNotifiers(), 0);

  // A component that goes while the host holds a written stream takes nothing from it.
  auto* Short = CreateComponentOf<TMemo>(Form->GetRoot());
  Short->SetName("Memo4");
  IPtr<IStream> Held = Files()->GetFileStream("Kiln.Form1.Memo4.Lines", fmCreate);
  ASSERT_EQ(Held->Write("late", 4), 4);
  Short->Destroy();
  Log.Clear();
  EXPECT_EQ(Files()->Count(), 0); // an entry without a module goes with its component
  Held = nullptr;
  EXPECT_EQ(Log.Count("Modified"), 0);

  // The host dropping a module frees its entry too.
  auto* Other = CreateComponentOf<TMemo>(Form->GetRoot());
  Other->SetName("Memo3");
  IPtr<TStringsHostModule> Third = OpenTextModule("Kiln.Form1.Memo3.Lines");
  EXPECT_EQ(Files()->Count(), 1);
  Third->CloseModule(false);
  EXPECT_EQ(Files()->Count(), 0);
}

} // namespace
