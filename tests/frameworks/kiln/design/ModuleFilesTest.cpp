//===- tests/frameworks/kiln/design/ModuleFilesTest.cpp - Modules on disk ===//
//
// Kiln modules written to real files in a scratch directory, closed and opened
// again through the designer: trees and values come back, in binary and in
// text; a file opened and saved unchanged keeps its bytes, and one edit changes
// only its own lines; a descendant is saved as its difference and reopens over
// its ancestor; saving works in its order and refuses
// read-only files; reading asks the user about errors and missing ancestors.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/RecoveryDialogs.h"
#include "tests/frameworks/kiln/design/ModuleFilesFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

TEST_F(ModuleFilesTest, AModuleWrittenClosedAndReopenedIsTheSameInBinaryAndInText) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  String Image = FormImage(Form->GetRoot());
  Form->Save();
  std::vector<std::uint8_t> Binary = FileBytes(PathOf("Form1.kfm"));
  ASSERT_FALSE(Binary.empty());
  EXPECT_EQ(TestStreamFormatOf(Binary), sofBinary);
  Form->Close();

  IPtr<IRoot> Again = OpenAt("Form1.kfm");
  EXPECT_EQ(FormImage(Again->GetRoot()), Image);
  EXPECT_FALSE(KilnRoot(Again)->GetTextLYT());
  EXPECT_EQ(Again->GetModifyTime(), Again->GetTimeAtLoad()) << "an unchanged module";
  // Handlers come back as methods of the module's class.
  auto* Button = Again->GetRoot()->FindComponent("Button1");
  EXPECT_EQ(QueryAs<IDesigner>(Again)->GetMethodName(static_cast<TButton*>(Button)->OnClick.Method()), "Button1Click");
  Again->Close();

  // The same module as text reads as text and writes text.
  WriteFile(PathOf("Text1.kfm"), ToTextForm(Binary));
  IPtr<IRoot> Text = OpenAt("Text1.kfm");
  EXPECT_TRUE(KilnRoot(Text)->GetTextLYT());
  EXPECT_EQ(FormImage(Text->GetRoot()), Image);
  KilnRoot(Text)->Modified();
  Text->Save();
  EXPECT_GE(TestStreamFormatOf(FileBytes(PathOf("Text1.kfm"))), sofText);
}

TEST_F(ModuleFilesTest, OpenAndSaveKeepsTheBytesAndOneMoveChangesOnlyItsLines) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  Form->Save();
  Form->Close();
  std::vector<std::uint8_t> Binary = FileBytes(PathOf("Form1.kfm"));
  WriteFile(PathOf("Text1.kfm"), ToTextForm(Binary));
  std::vector<std::uint8_t> Text = FileBytes(PathOf("Text1.kfm"));

  for (const char* File : {"Form1.kfm", "Text1.kfm"}) {
    IPtr<IRoot> Module = OpenAt(File);
    Module->Save();
    Module->Close();
  }
  EXPECT_EQ(FileBytes(PathOf("Form1.kfm")), Binary);
  EXPECT_EQ(FileBytes(PathOf("Text1.kfm")), Text);

  // A button moved by a drag: its Left and Top lines change, nothing else.
  Env->Options.UseDesignerGuidelines = false;
  IPtr<IRoot> Module = OpenAt("Text1.kfm");
  KilnRoot(Module)->SelectComponent(Module->GetRoot()->FindComponent("Button1"));
  Drag(KilnSurfaceOf(Module), {20, 20}, {52, 36});
  Module->Save();
  std::vector<String> Before = LinesOf(Text), After = LinesOf(FileBytes(PathOf("Text1.kfm")));
  ASSERT_EQ(Before.size(), After.size());
  std::vector<String> Changed;
  for (std::size_t I = 0; I < Before.size(); ++I)
    if (Before[I] != After[I]) Changed.push_back(Before[I] + " -> " + After[I]);
  EXPECT_EQ(Changed, (std::vector<String>{"    Left = 8 ->     Left = 40", "    Top = 8 ->     Top = 24"}));
}

TEST_F(ModuleFilesTest, ADescendantIsSavedAsItsDifferenceAndReopensOverItsAncestor) {
  IPtr<IRoot> Form1 = NewFormAt("Form1");
  BuildSample(Form1);
  Form1->Save();
  IPtr<IRoot> Form2 = NewFormAt("Form2", "Form1");
  auto* Button = static_cast<TButton*>(Form2->GetRoot()->FindComponent("Button1"));
  Button->SetCaption("Mine");
  KilnRoot(Form2)->CreateComponent(TEdit::StaticClass(), Form2->GetRoot(), 200, 8, 121, 23);
  KilnRoot(Form2)->Modified();
  String Image = FormImage(Form2->GetRoot(), Form1->GetRoot());
  Form2->Save();
  String File = TextOf(ToTextForm(FileBytes(PathOf("Form2.kfm"))));
  EXPECT_EQ(File.rfind("inherited Form2: TForm2\n", 0), 0u) << File;
  EXPECT_NE(File.find("  inherited Button1: TButton\n    Caption = \"Mine\"\n  end\n"), String::npos) << File;
  EXPECT_NE(File.find("  inherited Label1: TLabel\n  end\n"), String::npos) << File;
  EXPECT_EQ(File.find("Name:"), String::npos) << "what the ancestor has stays out\n" << File;
  Form2->Close();
  Form1->Close();

  // Opening the descendant opens its ancestor through the host.
  Env->OnOpenModuleByName = [this](const String& Name) { OpenAt(Name + ".kfm"); };
  IPtr<IRoot> Again = OpenAt("Form2.kfm", "TForm1");
  ASSERT_TRUE(Again->GetRoot());
  IPtr<IRoot> Ancestor = Again->GetDesigner() ? QueryAs<IInternalRoot>(Again)->GetAncestorRoot() : nullptr;
  ASSERT_TRUE(Ancestor && Ancestor->GetRoot());
  EXPECT_EQ(FormImage(Again->GetRoot(), Ancestor->GetRoot()), Image);
  EXPECT_TRUE(Again->GetRoot()->FindComponent("Label1")->ComponentState().Contains(csAncestor));
  EXPECT_FALSE(Again->GetRoot()->FindComponent("Edit2")->ComponentState().Contains(csAncestor));
  // The ancestor's change still reaches it.
  static_cast<TButton*>(Ancestor->GetRoot()->FindComponent("Button1"))->SetHint("from the ancestor");
  KilnRoot(Ancestor)->Modified();
  EXPECT_EQ(static_cast<TButton*>(Again->GetRoot()->FindComponent("Button1"))->Hint(), "from the ancestor");
  EXPECT_EQ(static_cast<TButton*>(Again->GetRoot()->FindComponent("Button1"))->Caption(), "Mine");
}

TEST_F(ModuleFilesTest, SavingWritesATemporaryFileKeepsABackupAndRefusesReadOnlyFiles) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  Form->Save();
  std::vector<std::uint8_t> First = FileBytes(PathOf("Form1.kfm"));
  EXPECT_FALSE(Exists(PathOf("Form1.$$$")));
  EXPECT_EQ(Form->GetModifyTime(), Form->GetTimeAtLoad());
  // Saved again unchanged: no backup.
  Form->Save();
  EXPECT_FALSE(Exists(PathOf("Form1.~kfm")));
  // Changed, saved: the last good file becomes the backup.
  Env->CreateBackups = true;
  static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"))->SetCaption("Changed");
  KilnRoot(Form)->Modified();
  Form->Save();
  EXPECT_EQ(FileBytes(PathOf("Form1.~kfm")), First);
  EXPECT_NE(FileBytes(PathOf("Form1.kfm")), First);

  // Another program writes the file: the module notices once.
  EXPECT_FALSE(Form->CheckFileDate());
  std::filesystem::last_write_time(PathOf("Form1.kfm"),
                                   std::filesystem::last_write_time(PathOf("Form1.kfm")) + std::chrono::seconds(5));
  EXPECT_TRUE(Form->CheckFileDate());
  EXPECT_FALSE(Form->CheckFileDate());

  // A read-only file is refused and left alone; the module stays modified.
  std::vector<std::uint8_t> Second = FileBytes(PathOf("Form1.kfm"));
  MakeReadOnly(PathOf("Form1.kfm"));
  static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"))->SetCaption("Again");
  KilnRoot(Form)->Modified();
  try {
    Form->Save();
    FAIL() << "a read-only file was written";
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), Format("'%s' is a read-only file", PathOf("Form1.kfm")));
  }
  EXPECT_EQ(FileBytes(PathOf("Form1.kfm")), Second);
  EXPECT_NE(Form->GetModifyTime(), Form->GetTimeAtLoad());
}

TEST_F(ModuleFilesTest, TheImageIsWrittenOnceLentToTheHostAndGivenBack) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  TKilnRoot* Kiln = KilnRoot(Form);
  TStream* Image = Kiln->GetRootStream();
  Image->SetPosition(10);
  EXPECT_EQ(Kiln->GetRootStream(), Image) << "no change: the cached image";
  EXPECT_EQ(Image->Position(), 0);
  std::int64_t Size = Image->Size();
  {
    IPtr<IDatedStream> Lent = Form->FormFileOpen();
    EXPECT_EQ(Lent->GetModifyTime(), Form->GetModifyTime());
    std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(Size));
    EXPECT_EQ(Lent->Read(Bytes.data(), Size), Size);
    EXPECT_EQ(Lent->Write(Bytes.data(), 1), 0) << "a read-only view";
  }
  EXPECT_EQ(Kiln->GetRootStream(), Image) << "given back unchanged";
  {
    IPtr<IDatedStream> Lent = Form->FormFileOpen();
    Kiln->Modified(); // the image is stale: freed when the view goes
  }
  TStream* Fresh = Kiln->GetRootStream();
  EXPECT_EQ(Fresh->Size(), Size);
}

TEST_F(ModuleFilesTest, ReadErrorsAskTheUserWhoMayIgnoreOnceIgnoreAllOrCancel) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  Form->Save();
  Form->Close();
  // Two properties no class has any more.
  String Text = TextOf(ToTextForm(FileBytes(PathOf("Form1.kfm"))));
  Text.replace(Text.find("    Caption = \"Go\"\n"), 0, "    Shade = 3\n");
  Text.replace(Text.find("    Caption = \"Name:\"\n"), 0, "    Glow = 1\n");
  WriteFile(PathOf("Broken.kfm"), std::vector<std::uint8_t>(Text.begin(), Text.end()));

  std::vector<String> Asked;
  TKilnRoot::ReadErrorAnswer = [&](const String& Message) {
    Asked.push_back(Message);
    return rerOK;
  };
  IPtr<IRoot> Ignored = OpenAt("Broken.kfm");
  EXPECT_EQ(Asked, (std::vector<String>{"Error reading Button1.Shade: Property Shade does not exist",
                                         "Error reading Label1.Glow: Property Glow does not exist"}));
  EXPECT_TRUE(KilnRoot(Ignored)->HadReadError());
  EXPECT_NE(Ignored->GetModifyTime(), Ignored->GetTimeAtLoad()) << "differs from its file: modified";
  EXPECT_EQ(static_cast<TButton*>(Ignored->GetRoot()->FindComponent("Button1"))->Caption(), "Go");
  Ignored->Close();

  Asked.clear();
  TKilnRoot::ReadErrorAnswer = [&](const String& Message) {
    Asked.push_back(Message);
    return rerIgnoreAll;
  };
  IPtr<IRoot> All = OpenAt("Broken.kfm");
  EXPECT_EQ(Asked.size(), 1u) << "no further question in this read";
  All->Close();

  // Without the host's answer the user is asked, through the read error dialog.
  int Roots = Designer->GetRootsCount();
  TKilnRoot::ReadErrorAnswer = nullptr;
  DialogScript().Answer(mrCancel);
  EXPECT_THROW(OpenAt("Broken.kfm"), EReadError);
  EXPECT_EQ(DialogScript().Shown().back().Caption, "Error Reading Form: 'Broken'");
  EXPECT_EQ(Designer->GetRootsCount(), Roots);
}

TEST_F(ModuleFilesTest, AnInheritedComponentTheAncestorLostIsRecoveredAsTheUserSays) {
  SaveDescendantThenLoseItsButton();

  std::vector<String> Asked;
  auto Answer = [&](TRecoveryResult Result, const String& Rename) {
    TKilnRoot::AncestorRecoveryAnswer = [&, Result, Rename](const String& RootName, const String& AncestorName,
                                                            String& NewName, const String& Candidates, bool Nested) {
      Asked.push_back(RootName + "|" + AncestorName + "|" + NewName + "|" + Candidates + "|" + (Nested ? "1" : "0"));
      if (!Rename.empty()) NewName = Rename;
      return Result;
    };
  };
  Answer(rrCreate, "");
  IPtr<IRoot> Created = OpenAt("Form2.kfm", "TForm1");
  EXPECT_EQ(Asked, (std::vector<String>{"Form2|Form1|Button1|Button2|0"}));
  auto* Made = static_cast<TButton*>(Created->GetRoot()->FindComponent("Button1"));
  ASSERT_NE(Made, nullptr);
  EXPECT_FALSE(Made->ComponentState().Contains(csAncestor));
  EXPECT_EQ(Made->Caption(), "Mine");
  Created->Close();

  // A name the ancestor does not have either: the reader's error, and nothing opens.
  Answer(rrRename, "Nothing");
  int Roots = Designer->GetRootsCount();
  EXPECT_THROW(OpenAt("Form2.kfm", "TForm1"), EReadError);
  EXPECT_EQ(Designer->GetRootsCount(), Roots);

  Answer(rrRename, "Button2");
  IPtr<IRoot> Renamed = OpenAt("Form2.kfm", "TForm1");
  EXPECT_EQ(static_cast<TButton*>(Renamed->GetRoot()->FindComponent("Button2"))->Caption(), "Mine");
  Renamed->Close();

  Asked.clear();
  int Questions = 0;
  TKilnRoot::ReadErrorAnswer = [&](const String&) {
    ++Questions;
    return rerCancel;
  };
  Answer(rrDelete, "");
  IPtr<IRoot> Deleted = OpenAt("Form2.kfm", "TForm1");
  EXPECT_EQ(Asked.size(), 1u);
  EXPECT_EQ(Questions, 0) << "the dropped component's error passes without a question";
  EXPECT_EQ(Deleted->GetRoot()->FindComponent("Button1"), nullptr);
}

} // namespace

namespace {

/// A file that stops taking bytes half way, as a full disk does.
class TFullDiskStream : public TStream {
  FK_CLASS(TFullDiskStream, TStream)
  TFullDiskStream() = default;
  TFullDiskStream(TStream* File, std::int64_t Room) : FFile(File), FRoom(Room) {}
  void BeforeDestruction() override {
    FreeAndNil(FFile);
    inherited::BeforeDestruction();
  }
  std::int64_t Read(void* Buffer, std::int64_t Count) override { return FFile->Read(Buffer, Count); }
  std::int64_t Write(const void* Buffer, std::int64_t Count) override {
    std::int64_t Taken = std::min(Count, FRoom);
    FRoom -= Taken;
    return Taken > 0 ? FFile->Write(Buffer, Taken) : 0;
  }
  std::int64_t Seek(std::int64_t Offset, TSeekOrigin Origin) override { return FFile->Seek(Offset, Origin); }

private:
  TStream* FFile = nullptr;
  std::int64_t FRoom = 0;
};
FK_IMPLEMENT(TFullDiskStream, "ModuleFilesTest") {}

/// The Kiln designer whose file operations log what they are asked and fail the one
/// named in `Failing`: "open", "write", "written", "rename to backup", "rename into place".
class TFlakyFilesDesigner : public TKilnDesigner {
  FK_CLASS(TFlakyFilesDesigner, TKilnDesigner)
  using TKilnDesigner::TKilnDesigner;
  String Failing;
  std::vector<String> Calls;

  static String Base(const String& Path) { return std::filesystem::path(Path).filename().string(); }
  TStream* OpenFile(const String& FileSystem, const String& Name, int Mode) override {
    Calls.push_back("OpenFile(" + Base(Name) + ")");
    if (Mode != 65280) return TKilnDesigner::OpenFile(FileSystem, Name, Mode);
    if (Failing == "open") throw EFCreateError("Cannot create file \"" + Name + "\". No space left on device");
    TStream* File = TKilnDesigner::OpenFile(FileSystem, Name, Mode);
    return Failing == "write" ? new TFullDiskStream(File, 100) : File;
  }
  void FileWritten(const String&, TStream*) override {
    Calls.push_back("FileWritten");
    if (Failing == "written") throw EWriteError("Stream write error");
  }
  bool DeleteFile(const String& FileSystem, const String& Name) override {
    Calls.push_back("DeleteFile(" + Base(Name) + ")");
    return TKilnDesigner::DeleteFile(FileSystem, Name);
  }
  bool RenameFile(const String& FileSystem, const String& OldName, const String& NewName) override {
    Calls.push_back("RenameFile(" + Base(OldName) + "," + Base(NewName) + ")");
    bool ToBackup = NewName.find(".~") != String::npos;
    if (Failing == (ToBackup ? "rename to backup" : "rename into place")) return false;
    return TKilnDesigner::RenameFile(FileSystem, OldName, NewName);
  }
};
FK_IMPLEMENT(TFlakyFilesDesigner, "ModuleFilesTest") {}

struct FailingDiskTest : ModuleFilesTest {
  TFlakyFilesDesigner* Files = nullptr;
  void SetUp() override {
    ModuleFilesTest::SetUp();
    Designers()->UnregisterDesigner(Designer);
    IPtr<TFlakyFilesDesigner> Flaky = New<TFlakyFilesDesigner>(InterfaceOf<IDesignEnvironment>(Env.Get()));
    Files = Flaky.Get();
    Designer = InterfaceOf<IComponentDesigner>(Flaky.Get());
    Designers()->RegisterDesigner(Designer);
  }
};

TEST_F(FailingDiskTest, SaveWorksInTheOrderOfATemporaryFileABackupAndARename) {
  Env->CreateBackups = true;
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  Files->Calls.clear();
  Form->Save(); // changed since it was made; no file yet to keep
  EXPECT_EQ(Files->Calls, (std::vector<String>{"OpenFile(Form1.$$$)", "FileWritten", "DeleteFile(Form1.~kfm)",
                                               "RenameFile(Form1.$$$,Form1.kfm)"}));
  static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"))->SetCaption("Changed");
  KilnRoot(Form)->Modified();
  Files->Calls.clear();
  Form->Save(); // changed since saved: the file becomes the backup
  EXPECT_EQ(Files->Calls, (std::vector<String>{"OpenFile(Form1.$$$)", "FileWritten", "DeleteFile(Form1.~kfm)",
                                               "RenameFile(Form1.kfm,Form1.~kfm)", "RenameFile(Form1.$$$,Form1.kfm)"}));
  Files->Calls.clear();
  Form->Save(); // unchanged: replaced without a backup
  EXPECT_EQ(Files->Calls,
            (std::vector<String>{"OpenFile(Form1.$$$)", "FileWritten", "DeleteFile(Form1.kfm)", "RenameFile(Form1.$$$,Form1.kfm)"}));
}

TEST_F(FailingDiskTest, WhicheverStepFailsTheLastGoodSaveSurvivesAndTheModuleStaysModified) {
  Env->CreateBackups = true;
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  Form->Save();
  auto* Button = static_cast<TButton*>(Form->GetRoot()->FindComponent("Button1"));
  int Edit = 0;
  for (const char* Step : {"open", "write", "written", "rename to backup", "rename into place"}) {
    SCOPED_TRACE(Step);
    std::vector<std::uint8_t> LastGood = FileBytes(PathOf("Form1.kfm"));
    Button->SetCaption("Edit " + IntToStr(++Edit));
    KilnRoot(Form)->Modified();
    Files->Failing = Step;
    EXPECT_THROW(Form->Save(), Exception);
    Files->Failing.clear();
    bool Kept = FileBytes(PathOf("Form1.kfm")) == LastGood || FileBytes(PathOf("Form1.~kfm")) == LastGood;
    EXPECT_TRUE(Kept) << "the last good save is lost";
    EXPECT_TRUE(Form->GetRoot());
    EXPECT_NE(Form->GetModifyTime(), Form->GetTimeAtLoad()) << "still modified";
    // The next save goes through and reopens as the module is.
    Form->Save();
    IPtr<IRoot> Check = OpenAt("Form1.kfm");
    EXPECT_EQ(FormImage(Check->GetRoot()), FormImage(Form->GetRoot()));
    Check->Close();
  }
}

TEST_F(ModuleFilesTest, LinksToModulesThatAreNotOpenStopASaveUntilTheUserRedirectsThem) {
  IPtr<IRoot> Form1 = NewFormAt("Form1");
  IPtr<IRoot> Form2 = NewFormAt("Form2");
  IPtr<IRoot> Form3 = NewFormAt("Form3");
  auto* Label = static_cast<TLabel*>(KilnRoot(Form1)->CreateComponent(TLabel::StaticClass(), Form1->GetRoot(), 8, 8, 65, 17));
  Label->SetFocusControl(static_cast<TWinControl*>(
      KilnRoot(Form2)->CreateComponent(TEdit::StaticClass(), Form2->GetRoot(), 8, 8, 121, 23)));
  auto* Other = static_cast<TLabel*>(KilnRoot(Form1)->CreateComponent(TLabel::StaticClass(), Form1->GetRoot(), 8, 40, 65, 17));
  Other->SetFocusControl(static_cast<TWinControl*>(
      KilnRoot(Form3)->CreateComponent(TEdit::StaticClass(), Form3->GetRoot(), 8, 8, 121, 23)));
  KilnRoot(Form1)->Modified();
  // Form1 depends on the two modules it links to.
  std::vector<String> Linked;
  KilnRoot(Form1)->GetDependencies([&](const IPtr<IRoot>& R) { Linked.push_back(R->GetRootName()); });
  EXPECT_EQ(Linked, (std::vector<String>{"Form2", "Form3"}));
  Form1->Save();
  Form2->Save();
  Form3->Save();
  Form1->Close();
  Form2->Close();
  Form3->Close();

  // Opened where the host can open modules by name, the modules it links to come along.
  Env->OnOpenModuleByName = [this](const String& Name) { OpenAt(Name + ".kfm"); };
  IPtr<IRoot> WithLinks = OpenAt("Form1.kfm");
  EXPECT_EQ(Log.Count("OpenModuleByName(Form2)"), 1);
  EXPECT_EQ(Log.Count("OpenModuleByName(Form3)"), 1);
  auto* Linked2 = static_cast<TLabel*>(WithLinks->GetRoot()->FindComponent("Label1"))->FocusControl();
  ASSERT_NE(Linked2, nullptr);
  EXPECT_EQ(Linked2->Owner()->Name(), "Form2");
  std::vector<String> Units;
  KilnRoot(WithLinks)->GetUnits([&](const String& Unit) { Units.push_back(Unit); });
  // Label1's class up to TComponent, the classes of its font and of the edit it
  // focuses, Label2 adding nothing new; from the last recorded to the first.
  EXPECT_EQ(Units, (std::vector<String>{"KilnControls", "KilnStdCtrls", "KilnGraphics", "KilnGraphics", "Classes",
                                        "KilnControls", "KilnControls", "KilnStdCtrls"}));
  for (const char* Name : {"Form1", "Form2", "Form3"})
    for (const IPtr<IRoot>& R : Open)
      if (R->GetRoot() && R->GetRootName() == Name) R->Close();
  Env->OnOpenModuleByName = nullptr;

  // Reopened alone, its links wait for the other modules.
  IPtr<IRoot> Alone = OpenAt("Form1.kfm");
  KilnRoot(Alone)->Modified();
  auto Refusal = [&] {
    try {
      Alone->Save();
      return String("saved");
    } catch (const EComponentDesignerException& E) {
      return E.Message();
    }
  };
  // The user is asked, and cancels.
  DialogScript().Answer(mrCancel);
  EXPECT_EQ(Refusal(), "Module \"Form1\" references other modules and cannot be saved until the following modules are "
                       "loaded: Form2,Form3");
  ASSERT_EQ(DialogScript().Shown().size(), 1u);
  EXPECT_EQ(DialogScript().Shown()[0].Caption, "Confirmation");
  EXPECT_EQ(DialogScript().Shown()[0].Message,
            "Module 'Form1' links to module 'Form2' which cannot be found in the current project.  Do you wish to "
            "remove/redirect the links to another module?");
  EXPECT_EQ(DialogScript().Shown()[0].Buttons, (std::vector<String>{"Yes", "No", "Cancel"}));
  // The links to Form2 are redirected: no other module is open, so the user can only
  // remove them, by OK with nothing chosen.
  std::vector<String> Offered;
  DialogScript().AnswerBy([&](TCustomForm& Dialog) {
    TStrings* Items = static_cast<TLinkRedirect&>(Dialog).LinkNames->Items();
    for (int I = 0; I < Items->Count(); ++I) Offered.push_back(Items->Get(I));
    return ClickButton(Dialog, "OKBtn");
  });
  std::vector<String> Asked;
  TKilnRoot::RedirectLinksAnswer = [&](const String& Root, const String& Linked) {
    Asked.push_back(Root + "->" + Linked);
    return Asked.size() == 1 ? qrYes : qrNo;
  };
  EXPECT_EQ(Refusal(), "Module \"Form1\" references another module and cannot be saved until Form3 is loaded");
  EXPECT_EQ(Asked, (std::vector<String>{"Form1->Form2", "Form1->Form3"}));
  EXPECT_EQ(Offered, std::vector<String>{"<Remove links>"}) << "the module does not offer itself";
  EXPECT_EQ(DialogScript().Shown().back().Caption, "Link Redirection");
  EXPECT_TRUE(KilnRoot(Alone)->HadReadError()) << "a redirect changes what was read";
  TKilnRoot::RedirectLinksAnswer = [](const String&, const String&) { return qrYes; };
  DialogScript().Answer(mrOk);
  EXPECT_EQ(Refusal(), "saved");
}

} // namespace
