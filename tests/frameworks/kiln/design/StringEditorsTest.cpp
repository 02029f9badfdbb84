//===- tests/frameworks/kiln/design/StringEditorsTest.cpp - String list and long string editors ===//
//
// The string editors of the Kiln package on a designed form: the string list
// dialog with OK, Cancel, Esc, its file commands and help, the way into the
// code editor through a recording host, the long string and multi-line string
// editors, and the size and place a dialog family keeps.
//
//===----------------------------------------------------------------------===//
#include "editors/EditorRegistry.h"
#include "frameworks/kiln/KilnWindows.h"
#include "frameworks/kiln/design/MultiLineStringEdit.h"
#include "frameworks/kiln/design/StringsEdit.h"
#include "frameworks/kiln/design/ValueEdit.h"
#include "platform/ScopeGuard.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"
#include "tests/frameworks/kiln/design/StringsHost.h"

#include <cstdio>
#include <fstream>
#include <unistd.h>

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A component with a wide string property.
class TWideNote : public TComponent {
  FK_CLASS(TWideNote, TComponent)
  WideString Note() const { return FNote; }
  void SetNote(const WideString& Value) { FNote = Value; }

private:
  WideString FNote;
};
FK_IMPLEMENT(TWideNote, "StringEditorsTest") { B.Property("Note", &TWideNote::Note, &TWideNote::SetNote); }

constexpr const char* LinesFile = "Kiln.Form1.Memo1.Lines";

struct StringEditorsTest : KilnDesignFixture {
  IPtr<TStringsHostServices> Host;
  IPtr<IRoot> Form;
  TMemo* Memo = nullptr;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    ResetShared();
    Host = New<TStringsHostServices>(&Log);
    HalvernIDEServices = IPtr<IHalvernIDEServices>(Host.Get());
    RegisterStringsFileSystem();
    Form = NewForm("Form1");
    Memo = CreateComponentOf<TMemo>(Form->GetRoot());
    Memo->SetName("Memo1");
    Memo->Lines()->SetText("alpha\nbeta\n");
    Log.Clear();
  }
  void TearDown() override {
    EXPECT_EQ(DialogScript().PendingAnswers(), 0);
    UnregisterStringsFileSystem();
    KilnDesignFixture::TearDown();
    HalvernIDEServices = nullptr;
    Host = nullptr;
    ResetShared();
  }
  static void ResetShared() {
    DialogScript().Clear();
    StrEditDlgPlacement() = {};
    MultiLineStringEditDlgPlacement() = {};
  }

  /// The editor the registries choose for `Instance`'s property `Name`.
  IPtr<IProperty> EditorOf(TPersistent* Instance, const char* Name, TPropertyEditorClass Class = nullptr) {
    PPropInfo Prop = GetPropInfo(Instance, Name);
    TNewPropertyEditor New = NewPropertyEditor(Class ? Class : GetEditorClass(Prop, Instance), Form->GetDesigner(), 1);
    New.Editor->SetPropEntry(0, Instance, Prop);
    New.Editor->Initialize();
    return New.Prop;
  }
  /// The next dialog is answered by `User` on the string list dialog.
  static void OnStringsDialog(std::function<TModalResult(TStringsEditDlg&)> User) {
    DialogScript().AnswerBy([User](TCustomForm& F) { return User(dynamic_cast<TStringsEditDlg&>(F)); });
  }
  static void OnMultiLineDialog(std::function<TModalResult(TMultiLineStringEditDlg&)> User) {
    DialogScript().AnswerBy([User](TCustomForm& F) { return User(dynamic_cast<TMultiLineStringEditDlg&>(F)); });
  }
};

//===----------------------------------------------------------------------===//
// The string list dialog
//===----------------------------------------------------------------------===//

TEST_F(StringEditorsTest, TheStringListDialogShowsItsTextsAndStoresTheLinesOnOK) {
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  ASSERT_TRUE(dynamic_cast<TStringListProperty*>(Lines.Get()));
  EXPECT_EQ(Lines->GetAttributes(), (TPropertyAttributes{paMultiSelect, paReadOnly, paDialog}));

  OnStringsDialog([](TStringsEditDlg& D) {
    EXPECT_EQ(D.Caption(), "String List Editor");
    EXPECT_EQ(D.HelpContext(), 26000);
    EXPECT_EQ(D.OKButton->Caption(), "&OK");
    EXPECT_EQ(D.CancelButton->Caption(), "Cancel");
    EXPECT_EQ(D.HelpButton->Caption(), "Help");
    EXPECT_EQ(D.CodeWndBtn->Caption(), "&Code Editor...");
    EXPECT_EQ(D.CodeWndBtn->ModalResult(), 6);
    EXPECT_TRUE(D.CodeWndBtn->Enabled());
    EXPECT_TRUE(D.CodeEditorItem->Enabled());
    EXPECT_EQ(D.LoadItem->Caption(), "&Load...");
    EXPECT_EQ(D.SaveItem->Caption(), "&Save...");
    EXPECT_EQ(D.CodeEditorItem->Caption(), "&Code Editor...");
    EXPECT_EQ(D.OpenDialog->Title(), "Load string list");
    EXPECT_EQ(D.OpenDialog->HelpContext(), 27040);
    EXPECT_EQ(D.SaveDialog->Title(), "Save string list");
    EXPECT_EQ(D.SaveDialog->HelpContext(), 27050);
    EXPECT_EQ(D.SaveDialog->DefaultExt(), "TXT");
    EXPECT_EQ(D.OpenDialog->Filter(), "Text files (*.TXT)|*.TXT|Config files (*.SYS;*.INI)|*.SYS;*.INI|Batch files "
                                      "(*.BAT)|*.BAT|All files (*.*)|*.*");
    EXPECT_EQ(D.ActiveControl(), D.Memo);
    EXPECT_FALSE(D.Memo->WordWrap());
    EXPECT_EQ(D.Memo->ScrollBars(), ssBoth);
    EXPECT_EQ(D.Memo->Font()->Name(), "Tahoma");
    EXPECT_EQ(D.Memo->Lines()->CommaText(), "alpha,beta");
    EXPECT_FALSE(D.Modified());
    // The status: the caret's line and column, the number of lines.
    EXPECT_EQ(D.PanelText(0), " line: 1");
    EXPECT_EQ(D.PanelText(1), "column: 1");
    EXPECT_EQ(D.PanelText(2), "lines: 2");
    D.Memo->SetSelStart(10); // "alpha\r\nbe|ta"
    EXPECT_TRUE(D.Modified()); // any event from the memo counts
    EXPECT_EQ(D.StatusBar->Panels()->Items(0)->Text(), " line: 2");
    EXPECT_EQ(D.StatusBar->Panels()->Items(1)->Text(), "column: 4");
    EXPECT_EQ(D.StatusBar->Panels()->Items(1)->Width(), 100);
    EXPECT_EQ(D.StatusBar->Panels()->Items(2)->Width(), 200);

    D.Memo->Lines()->SetText("one\ntwo\nthree");
    EXPECT_EQ(D.PanelText(2), "lines: 3");
    return ClickButton(D, "OKButton");
  });
  Lines->Edit();
  EXPECT_EQ(Memo->Lines()->CommaText(), "one,two,three");
  EXPECT_EQ(Log.Count("Modified"), 1);
  ASSERT_EQ(DialogScript().Shown().size(), 1u);
  const TShownDialog& Shown = DialogScript().Shown().back();
  EXPECT_EQ(Shown.Caption, "String List Editor");
  EXPECT_EQ(Shown.DefaultButton, "OKButton");
  EXPECT_EQ(Shown.Buttons, (std::vector<String>{"CodeWndBtn", "OKButton", "CancelButton", "HelpButton"}));
  // The dialog is gone with the edit.
  EXPECT_EQ(Application()->FindComponent("StringsEditDlg"), nullptr);
}

TEST_F(StringEditorsTest, CancelAndEscChangeNothing) {
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  OnStringsDialog([](TStringsEditDlg& D) {
    D.Memo->Lines()->SetText("lost");
    return ClickButton(D, "CancelButton");
  });
  Lines->Edit();
  OnStringsDialog([](TStringsEditDlg& D) {
    D.Memo->Lines()->SetText("lost too");
    std::uint16_t Key = vkEscape;
    D.Memo->KeyDown(Key, {});
    return D.ModalResult();
  });
  Lines->Edit();
  EXPECT_EQ(Memo->Lines()->CommaText(), "alpha,beta");
  EXPECT_EQ(Log.Count("Modified"), 0);
  EXPECT_EQ(Log.Count("CreateModule"), 0);
  EXPECT_EQ(StringsFileSystem()->Count(), 0);
}

TEST_F(StringEditorsTest, TheFileCommandsAndHelpOfTheDialog) {
  String Path = "/tmp/fk_strings_" + IntToStr(getpid()) + ".txt";
  auto Remove = Finally([&Path]() noexcept { std::remove(Path.c_str()); });
  {
    std::ofstream Out(Path, std::ios::binary);
    Out << "from\r\nfile";
  }
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  OnStringsDialog([&](TStringsEditDlg& D) {
    DialogScript().Answer(mrOk, {Path});
    D.LoadItem->Click();
    EXPECT_EQ(D.Memo->Lines()->CommaText(), "from,file");
    // Saving offers the name the list came from.
    DialogScript().Answer(mrOk, {Path + ".out"});
    D.Memo->Lines()->Add("more");
    EXPECT_TRUE(D.FileSaveCmd->Execute());
    // A file that cannot be read: the error passes up.
    DialogScript().Answer(mrOk, {"/nonexistent/dir/list.txt"});
    EXPECT_ANY_THROW(D.LoadItem->Click());
    // Cancelling the open dialog loads nothing.
    DialogScript().Answer(mrCancel);
    D.LoadItem->Click();
    EXPECT_EQ(D.Memo->Lines()->CommaText(), "from,file,more");
    D.HelpButton->Click();
    return ClickButton(D, "CancelButton");
  });
  size_t HelpBefore = Application()->HelpRequests().size();
  Lines->Edit();
  auto Remove2 = Finally([&Path]() noexcept { std::remove((Path + ".out").c_str()); });
  std::ifstream In(Path + ".out", std::ios::binary);
  String Saved((std::istreambuf_iterator<char>(In)), std::istreambuf_iterator<char>());
  EXPECT_EQ(Saved, "from\r\nfile\r\nmore\r\n");
  ASSERT_EQ(Application()->HelpRequests().size(), HelpBefore + 1);
  EXPECT_EQ(Application()->HelpRequests().back(), "context 26000");
  const auto& Shown = DialogScript().Shown();
  ASSERT_EQ(Shown.size(), 5u);
  EXPECT_EQ(Shown[1].Kind, "OpenDialog");
  EXPECT_EQ(Shown[1].Caption, "Load string list");
  EXPECT_EQ(Shown[2].Kind, "SaveDialog");
  EXPECT_EQ(Shown[2].Values, std::vector<String>{Path});
  EXPECT_EQ(Memo->Lines()->CommaText(), "alpha,beta"); // cancelled
}

TEST_F(StringEditorsTest, TheValueListDialogEditsNamesAndValues) {
  auto* Grid = CreateComponentOf<TValueListEditor>(Form->GetRoot());
  Grid->SetName("Grid1");
  Grid->Strings()->SetValues("Width", "80");
  IPtr<IProperty> Strings = EditorOf(Grid, "Strings");
  ASSERT_TRUE(dynamic_cast<TValueListProperty*>(Strings.Get()));
  EXPECT_TRUE(Strings->GetAttributes().Contains(paDialog));
  DialogScript().AnswerBy([](TCustomForm& F) {
    auto& D = dynamic_cast<TValueEditDlg&>(F);
    EXPECT_EQ(D.Caption(), "Value List Editor");
    EXPECT_EQ(D.HelpContext(), 26005);
    EXPECT_EQ(D.ActiveControl(), D.ValueListEditor1);
    EXPECT_EQ(D.ValueListEditor1->KeyOptions(), (TKeyOptions{keyEdit, keyAdd, keyDelete}));
    EXPECT_EQ(D.ValueListEditor1->ColWidth(0), 150);
    EXPECT_EQ(D.ValueListEditor1->ColWidth(1), 249);
    EXPECT_EQ(D.GetLines()->Values("Width"), "80");
    EXPECT_FALSE(D.Modified());
    D.ValueListEditor1->Strings()->SetValues("Height", "20");
    EXPECT_TRUE(D.Modified());
    return ClickButton(D, "OKButton");
  });
  Strings->Edit();
  EXPECT_EQ(Grid->Strings()->CommaText(), "Width=80,Height=20");
  // Esc cancels.
  DialogScript().AnswerBy([](TCustomForm& F) {
    auto& D = dynamic_cast<TValueEditDlg&>(F);
    D.ValueListEditor1->Strings()->Clear();
    std::uint16_t Key = vkEscape;
    D.ValueListEditor1->KeyDown(Key, {});
    return D.ModalResult();
  });
  Strings->Edit();
  EXPECT_EQ(Grid->Strings()->CommaText(), "Width=80,Height=20");
  // The list goes into the code editor as any string list does.
  DialogScript().AnswerBy([](TCustomForm& F) { return ClickButton(F, "CodeWndBtn"); });
  Strings->Edit();
  EXPECT_EQ(Host->Find("Kiln.Form1.Grid1.Strings")->Buffer, "Width=80\r\nHeight=20\r\n");
}

//===----------------------------------------------------------------------===//
// Into the code editor
//===----------------------------------------------------------------------===//

TEST_F(StringEditorsTest, TheCodeEditorButtonOpensTheListAsAVirtualFile) {
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  OnStringsDialog([](TStringsEditDlg& D) {
    D.Memo->Lines()->SetText("edited\nin the dialog");
    return ClickButton(D, "CodeWndBtn");
  });
  int Before = DateTimeToFileDate(Now());
  Lines->Edit();
  int After = DateTimeToFileDate(Now());
  EXPECT_EQ(Log.Text(), "CreateModule(Text,Kiln.Form1.Memo1.Lines,Tessel.TStringsFileSystem)\n"
                        "MarkModified(Kiln.Form1.Memo1.Lines)\n"
                        "Show(Kiln.Form1.Memo1.Lines)\n");
  IPtr<TStringsHostModule> Text = Host->Find(LinesFile);
  ASSERT_TRUE(Text);
  EXPECT_EQ(Text->Buffer, "edited\r\nin the dialog\r\n");
  EXPECT_TRUE(Text->Editor->Modified);
  // The property keeps its lines until the code editor saves.
  EXPECT_EQ(Memo->Lines()->CommaText(), "alpha,beta");
  ASSERT_EQ(StringsFileSystem()->Count(), 1);
  int Age = StringsFileSystem()->FileAge(LinesFile);
  EXPECT_GE(Age, Before);
  EXPECT_LE(Age, After);

  Text->Buffer = "saved\r\nfrom the editor";
  Text->Save(false, false);
  EXPECT_EQ(Memo->Lines()->CommaText(), "saved,\"from the editor\"");
  EXPECT_EQ(Log.Count("Modified"), 1);

  // While the list is in the code editor, an edit shows the editor: no dialog opens.
  Log.Clear();
  Lines->Edit();
  EXPECT_EQ(Log.Text(), "Show(Kiln.Form1.Memo1.Lines)\n");
  bool Called = false;
  EXPECT_EQ(EditStringsWithCodeEditor(
                Memo, "Lines", Memo->Lines(), Form->GetDesigner(),
                [&](TStrings*, bool, TStrEditDlg*&, bool&, TStrings*&) { return Called = true, mrOk; },
                [](TStrings*) {}),
            mrCancel);
  EXPECT_FALSE(Called);
  EXPECT_EQ(DialogScript().Shown().size(), 1u);
}

TEST_F(StringEditorsTest, AListLeftUnchangedOpensAsUnchangedAndTheMenuItemGoesTheSameWay) {
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  OnStringsDialog([](TStringsEditDlg& D) {
    D.CodeEditorItem->Click();
    return D.ModalResult();
  });
  Lines->Edit();
  EXPECT_EQ(Log.Count("CreateModule"), 1);
  EXPECT_EQ(Log.Count("MarkModified"), 0);
  EXPECT_EQ(Log.Count("Show("), 1);
  EXPECT_EQ(Host->Find(LinesFile)->Buffer, "alpha\r\nbeta\r\n");
}

TEST_F(StringEditorsTest, AModuleTheHostDoesNotCreateLeavesThePropertyAsItIs) {
  Host->RefuseModules = true;
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  OnStringsDialog([](TStringsEditDlg& D) {
    D.Memo->Lines()->SetText("dropped");
    return ClickButton(D, "CodeWndBtn");
  });
  Lines->Edit();
  EXPECT_EQ(Log.Count("CreateModule"), 1);
  EXPECT_EQ(Log.Count("Show("), 0);
  EXPECT_EQ(StringsFileSystem()->Count(), 0);
  EXPECT_EQ(Memo->Lines()->CommaText(), "alpha,beta");
  EXPECT_EQ(Log.Count("Modified"), 0);
}

TEST_F(StringEditorsTest, WithoutAVirtualFileNameTheDialogWorksAlone) {
  // A memo owned by another component, not by the root.
  auto* Nested = CreateComponentOf<TMemo>(Memo);
  Nested->SetName("Inner");
  IPtr<IProperty> Lines = EditorOf(Nested, "Lines");
  auto Disabled = [](TStringsEditDlg& D) {
    EXPECT_FALSE(D.CodeWndBtn->Enabled());
    EXPECT_FALSE(D.CodeEditorItem->Enabled());
    D.Memo->Lines()->SetText("alone");
    return ClickButton(D, "OKButton");
  };
  OnStringsDialog(Disabled);
  Lines->Edit();
  EXPECT_EQ(Nested->Lines()->CommaText(), "alone");

  // Without the host's module services neither.
  HalvernIDEServices = nullptr;
  OnStringsDialog(Disabled);
  EditorOf(Memo, "Lines")->Edit();
  EXPECT_EQ(Memo->Lines()->CommaText(), "alone");
  HalvernIDEServices = IPtr<IHalvernIDEServices>(Host.Get());
  EXPECT_EQ(Log.Count("CreateModule"), 0);
}

//===----------------------------------------------------------------------===//
// Long strings and multi-line strings
//===----------------------------------------------------------------------===//

TEST_F(StringEditorsTest, ALongStringGetsNoFinalLineBreak) {
  auto* Edit = CreateComponentOf<TEdit>(Form->GetRoot());
  Edit->SetName("Edit1");
  Edit->SetText("first\r\nsecond");
  IPtr<IProperty> Text = EditorOf(Edit, "Text", TLongStringProperty::StaticClass());
  EXPECT_TRUE(Text->GetAttributes().Contains(paDialog));
  OnStringsDialog([](TStringsEditDlg& D) {
    EXPECT_EQ(D.Memo->Lines()->CommaText(), "first,second");
    EXPECT_FALSE(D.CodeWndBtn->Enabled());
    D.Memo->Lines()->Add("third");
    return ClickButton(D, "OKButton");
  });
  Text->Edit();
  EXPECT_EQ(Edit->Text(), "first\r\nsecond\r\nthird");
  OnStringsDialog([](TStringsEditDlg& D) {
    D.Memo->Lines()->Clear();
    return ClickButton(D, "CancelButton");
  });
  Text->Edit();
  EXPECT_EQ(Edit->Text(), "first\r\nsecond\r\nthird");

  auto* Note = CreateComponentOf<TWideNote>(Form->GetRoot());
  Note->SetName("Note1");
  Note->SetNote(u"Grüße\r\nwide");
  IPtr<IProperty> Wide = EditorOf(Note, "Note", TLongWideStringProperty::StaticClass());
  EXPECT_TRUE(Wide->GetAttributes().Contains(paDialog));
  OnStringsDialog([](TStringsEditDlg& D) {
    EXPECT_EQ(D.Memo->Lines()->Get(0), "Grüße");
    D.Memo->Lines()->Put(1, "wörld");
    return ClickButton(D, "OKButton");
  });
  Wide->Edit();
  EXPECT_EQ(Note->Note(), u"Grüße\r\nwörld");
}

TEST_F(StringEditorsTest, AMultiLineStringLosesOnlyItsFinalLineBreaks) {
  auto* Label = CreateComponentOf<TLabel>(Form->GetRoot());
  Label->SetName("Label1");
  Label->SetCaption("old");
  IPtr<IProperty> Caption = EditorOf(Label, "Caption");
  ASSERT_TRUE(dynamic_cast<TMultiLineStringProperty*>(Caption.Get()));
  EXPECT_EQ(Caption->GetAttributes(), (TPropertyAttributes{paDialog, paMultiSelect, paAutoUpdate}));
  OnMultiLineDialog([](TMultiLineStringEditDlg& D) {
    EXPECT_EQ(D.Caption(), "Multi-Line String Editor");
    EXPECT_EQ(D.OkButton->Caption(), "&OK");
    EXPECT_EQ(D.Cancel->Caption(), "Cancel");
    EXPECT_EQ(D.CaptionEdit->Lines()->CommaText(), "old");
    EXPECT_EQ(D.Width(), 400);
    EXPECT_EQ(D.Height(), 240);
    D.CaptionEdit->Lines()->SetText("two\nlines\n\n\n");
    return ClickButton(D, "OkButton");
  });
  Caption->Edit();
  EXPECT_EQ(Label->Caption(), "two\r\nlines");
  OnMultiLineDialog([](TMultiLineStringEditDlg& D) {
    D.CaptionEdit->Lines()->SetText("gone");
    std::uint16_t Key = vkEscape;
    D.CaptionEdit->KeyDown(Key, {});
    return D.ModalResult();
  });
  Caption->Edit();
  EXPECT_EQ(Label->Caption(), "two\r\nlines");
  EXPECT_EQ(DialogScript().Shown().back().Buttons, (std::vector<String>{"OkButton", "Cancel"}));
}

TEST_F(StringEditorsTest, ASecondDialogTakesTheSizeAndPlaceOfTheLast) {
  IPtr<IProperty> Lines = EditorOf(Memo, "Lines");
  OnStringsDialog([](TStringsEditDlg& D) {
    // The first one opens at its least size, in the middle of the work area.
    TRect Work = Screen()->WorkAreaRect();
    EXPECT_EQ(D.BoundsRect(), Bounds(Work.Left + (Work.Width() - 437) / 2, Work.Top + (Work.Height() - 306) / 2,
                                     437, 306));
    D.SetBounds(30, 40, 600, 500);
    return ClickButton(D, "CancelButton");
  });
  Lines->Edit();
  // At twice the pixels per inch, twice the size and place; kept at the default again.
  ControlPPIHook = [](const TControl*) { return 192; };
  auto Restore = Finally([]() noexcept { ControlPPIHook = nullptr; });
  OnStringsDialog([](TStringsEditDlg& D) {
    EXPECT_EQ(D.BoundsRect(), Bounds(60, 80, 1200, 1000));
    return ClickButton(D, "CancelButton");
  });
  Lines->Edit();
  ControlPPIHook = nullptr;
  OnStringsDialog([](TStringsEditDlg& D) {
    EXPECT_EQ(D.BoundsRect(), Bounds(30, 40, 600, 500));
    D.SetBounds(30, 40, 100, 100); // below the least size
    return ClickButton(D, "CancelButton");
  });
  Lines->Edit();
  OnStringsDialog([](TStringsEditDlg& D) {
    EXPECT_EQ(D.BoundsRect(), Bounds(30, 40, 437, 306));
    return ClickButton(D, "CancelButton");
  });
  Lines->Edit();
  // The multi-line dialog keeps its own.
  EXPECT_EQ(MultiLineStringEditDlgPlacement().Width, 0);
}

} // namespace
