//===- tests/frameworks/kiln/design/ModuleFilesFixture.h - Modules in a scratch directory ===//
//
// The Kiln designer at work on modules whose files live in a scratch directory
// that the test removes: new modules named after their file, existing files
// opened through the designer, a sample form with a component of each kind, and
// helpers that read, write and compare the bytes of files.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "frameworks/kiln/KilnDialogs.h"
#include "platform/Filer.h"

#include <filesystem>
#include <fstream>

namespace formkit::fakes {

struct ModuleFilesTest : KilnDesignFixture {
  std::filesystem::path Dir;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    char Template[] = "/tmp/fk-modules-XXXXXX";
    ASSERT_NE(::mkdtemp(Template), nullptr);
    Dir = Template;
  }
  void TearDown() override {
    TKilnRoot::ReadErrorAnswer = nullptr;
    TKilnRoot::AncestorRecoveryAnswer = nullptr;
    TKilnRoot::RedirectLinksAnswer = nullptr;
    TKilnRoot::RedirectTarget = nullptr;
    EXPECT_EQ(DialogScript().PendingAnswers(), 0) << "a question the test expected was not asked";
    DialogScript().Clear();
    Env->OnOpenModuleByName = nullptr;
    KilnDesignFixture::TearDown();
    std::error_code Ignored;
    std::filesystem::permissions(Dir, std::filesystem::perms::owner_all, Ignored);
    for (auto& Entry : std::filesystem::directory_iterator(Dir, Ignored))
      std::filesystem::permissions(Entry.path(), std::filesystem::perms::owner_all, Ignored);
    std::filesystem::remove_all(Dir, Ignored);
  }

  String PathOf(const String& File) const { return (Dir / File).string(); }

  /// A new module `Name` whose file is `Name`.kfm in the scratch directory.
  IPtr<IRoot> NewFormAt(const String& Name, const String& AncestorName = "") {
    IPtr<TRecordingModule> Module = New<TRecordingModule>(PathOf(Name + ".kfm"), &Log);
    IPtr<IRoot> Root = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf(Name + ".kfm"), false,
                                            Name, AncestorName, "", nullptr, "");
    Open.push_back(Root);
    return Root;
  }
  /// Opens the existing file `File` of the scratch directory; its source names
  /// `AncestorClass` as the class's ancestor, and `Ancestor` is the open ancestor given.
  IPtr<IRoot> OpenAt(const String& File, const String& AncestorClass = "", const IPtr<IRoot>& Ancestor = nullptr) {
    IPtr<TRecordingModule> Module = New<TRecordingModule>(PathOf(File), &Log);
    Module->AncestorClassName = AncestorClass;
    IPtr<IRoot> Root =
        Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf(File), true, "", "", "", Ancestor, "");
    Open.push_back(Root);
    return Root;
  }

  /// Button1 ("Go", a click handler), Label1 ("Name:", focusing Edit1), Edit1, Panel1
  /// holding CheckBox1, Timer1 and StatusBar1 with two panels.
  void BuildSample(const IPtr<IRoot>& Form) {
    TKilnRoot* Kiln = KilnRoot(Form);
    TComponent* Root = Form->GetRoot();
    auto* Button = static_cast<TButton*>(Kiln->CreateComponent(TButton::StaticClass(), Root, 8, 8, 75, 25));
    Button->SetCaption("Go");
    Button->OnClick = TNotifyEvent(QueryAs<IDesigner>(Form)->CreateMethod("Button1Click", IPtr<IEventInfo>()));
    auto* Edit = static_cast<TEdit*>(Kiln->CreateComponent(TEdit::StaticClass(), Root, 80, 48, 121, 23));
    auto* Label = static_cast<TLabel*>(Kiln->CreateComponent(TLabel::StaticClass(), Root, 8, 48, 65, 17));
    Label->SetCaption("Name:");
    Label->SetFocusControl(Edit);
    TComponent* Panel = Kiln->CreateComponent(TPanel::StaticClass(), Root, 8, 80, 185, 41);
    Kiln->CreateComponent(TCheckBox::StaticClass(), Panel, 8, 8, 97, 19);
    Kiln->CreateComponent(TTimer::StaticClass(), Root, 240, 8, 0, 0);
    auto* Bar = static_cast<TStatusBar*>(Kiln->CreateComponent(TStatusBar::StaticClass(), Root, 0, 0, 0, 0));
    Bar->Panels()->Add()->SetText("Ready");
    Bar->Panels()->Add()->SetWidth(80);
    Kiln->Modified();
  }

  /// Saves Form2, a descendant of the open Form1 (the sample and a second button), with
  /// its own caption "Mine" on Button1, closes it, and takes Button1 out of Form1: Form2's
  /// file records changes to a component its ancestor no longer has.
  void SaveDescendantThenLoseItsButton() {
    IPtr<IRoot> Form1 = NewFormAt("Form1");
    BuildSample(Form1);
    KilnRoot(Form1)->CreateComponent(TButton::StaticClass(), Form1->GetRoot(), 100, 8, 75, 25);
    Form1->Save();
    IPtr<IRoot> Form2 = NewFormAt("Form2", "Form1");
    static_cast<TButton*>(Form2->GetRoot()->FindComponent("Button1"))->SetCaption("Mine");
    KilnRoot(Form2)->Modified();
    Form2->Save();
    Form2->Close();
    Form1->GetRoot()->FindComponent("Button1")->Destroy();
    KilnRoot(Form1)->Modified();
  }

  static std::vector<std::uint8_t> FileBytes(const String& Path) {
    std::ifstream In(Path, std::ios::binary);
    return std::vector<std::uint8_t>(std::istreambuf_iterator<char>(In), {});
  }
  static void WriteFile(const String& Path, const std::vector<std::uint8_t>& Bytes) {
    std::ofstream Out(Path, std::ios::binary | std::ios::trunc);
    Out.write(reinterpret_cast<const char*>(Bytes.data()), static_cast<std::streamsize>(Bytes.size()));
  }
  static bool Exists(const String& Path) { return std::filesystem::exists(Path); }
  static void MakeReadOnly(const String& Path) {
    std::filesystem::permissions(Path, std::filesystem::perms::owner_read);
  }
  static String TextOf(const std::vector<std::uint8_t>& Bytes) { return String(Bytes.begin(), Bytes.end()); }
  static std::vector<String> LinesOf(const std::vector<std::uint8_t>& Bytes) {
    std::vector<String> Lines;
    String Line;
    for (std::uint8_t B : Bytes) {
      if (B != '\n') Line += static_cast<char>(B);
      else Lines.push_back(std::exchange(Line, String()));
    }
    if (!Line.empty()) Lines.push_back(Line);
    return Lines;
  }
  static TStreamOriginalFormat TestStreamFormatOf(const std::vector<std::uint8_t>& Bytes) {
    TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
    return TestStreamFormat(S.Get());
  }
  /// A binary form file (with its resource header) as the text form.
  static std::vector<std::uint8_t> ToTextForm(const std::vector<std::uint8_t>& Binary) {
    TObjectGuard<TBytesStream> In(new TBytesStream(Binary));
    TObjectGuard<TMemoryStream> Out(new TMemoryStream);
    ObjectResourceToText(In.Get(), Out.Get());
    return std::vector<std::uint8_t>(Out->Memory(), Out->Memory() + Out->Size());
  }
};

} // namespace formkit::fakes
