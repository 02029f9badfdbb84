//===- tests/host/AddinCommandTest.cpp - formkit addin on the examples ----===//
//
// `formkit addin` on a copy of the examples: components listed, properties of
// several kinds read and written, components created in a container and on the
// form and deleted, each change saved and seen by the next run; every refusal
// with its message and exit code, and no file changed by it.
//
//===----------------------------------------------------------------------===//
#include "tests/host/ExamplesFixture.h"

using namespace formkit;

namespace {

namespace fs = std::filesystem;

struct AddinCommandTest : hosttest::ExamplesFixture {
  String Form1() const { return (Dir / "Form1.kfm").string(); }
  /// `formkit addin Form1.kfm Args...`.
  int Addin(std::vector<String> Args) {
    Args.insert(Args.begin(), {"addin", Form1()});
    return Run(std::move(Args));
  }
  /// The text a `get` prints, or the error it gives.
  String Get(const String& Path) {
    int Code = Addin({"get", Path});
    return Code == feOK ? Out.str() : "exit " + std::to_string(Code) + ": " + Err.str();
  }
};

TEST_F(AddinCommandTest, ComponentsListedReadAndEditedThroughTheFacadeEachChangeSaved) {
  ASSERT_EQ(Addin({"list"}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Form1\tTForm1\t\n"
                       "Panel1\tTPanel\tForm1\n"
                       "Label1\tTLabel\tPanel1\n"
                       "Edit1\tTEdit\tPanel1\n"
                       "CheckBox1\tTCheckBox\tPanel1\n"
                       "Frame11\tTFrame1\tForm1\n"
                       "Button1\tTButton\tForm1\n"
                       "Button2\tTButton\tForm1\n"
                       "StatusBar1\tTStatusBar\tForm1\n"
                       "Timer1\tTTimer\t\n");
  EXPECT_EQ(Err.str(), "");

  // Reads by kind: strings, integers, enumerations by name, objects and events.
  EXPECT_EQ(Get("Button1.Caption"), "OK\n");
  EXPECT_EQ(Get("Form1.Caption"), "Customer\n") << "the module's own name";
  EXPECT_EQ(Get("button1.caption"), "OK\n") << "names without regard to case";
  EXPECT_EQ(Get("Panel1.Width"), "457\n");
  EXPECT_EQ(Get("Panel1.Align"), "alNone\n");
  EXPECT_EQ(Get("CheckBox1.Checked"), "False\n");
  EXPECT_EQ(Get("Button1.Font"), "(TFont)\n");
  EXPECT_EQ(Get("Button1.OnClick"), "(none)\n");
  const std::map<String, String> Before = Files();
  EXPECT_EQ(Files(), Before) << "reads save nothing";

  // Writes, each saved: the next run reads them back from the file.
  ASSERT_EQ(Addin({"set", "Button1.Caption", "Done"}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "");
  EXPECT_NE(Read(Dir / "Form1.kfm").find("Caption = \"Done\""), String::npos);
  EXPECT_EQ(Get("Button1.Caption"), "Done\n");
  ASSERT_EQ(Addin({"set", "Panel1.Align", "alTop"}), feOK) << Err.str();
  EXPECT_EQ(Get("Panel1.Align"), "alTop\n");
  ASSERT_EQ(Addin({"set", "CheckBox1.Checked", "True"}), feOK) << Err.str();
  EXPECT_EQ(Get("CheckBox1.Checked"), "True\n");
  ASSERT_EQ(Addin({"set", "Button2.Left", "$10"}), feOK) << Err.str();
  EXPECT_EQ(Get("Button2.Left"), "16\n");

  // Created in a container and on the form, at the class's own size, in the middle.
  ASSERT_EQ(Addin({"create", "TButton", "Panel1"}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Button3\n");
  ASSERT_EQ(Addin({"create", "TTimer"}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Timer2\n");
  EXPECT_EQ(Get("Button3.Width"), "75\n");
  // Deleted.
  ASSERT_EQ(Addin({"delete", "Button2"}), feOK) << Err.str();
  ASSERT_EQ(Addin({"list"}), feOK);
  EXPECT_EQ(Out.str(), "Form1\tTForm1\t\n"
                       "Panel1\tTPanel\tForm1\n"
                       "Label1\tTLabel\tPanel1\n"
                       "Edit1\tTEdit\tPanel1\n"
                       "CheckBox1\tTCheckBox\tPanel1\n"
                       "Button3\tTButton\tPanel1\n"
                       "Frame11\tTFrame1\tForm1\n"
                       "Button1\tTButton\tForm1\n"
                       "StatusBar1\tTStatusBar\tForm1\n"
                       "Timer1\tTTimer\t\n"
                       "Timer2\tTTimer\t\n");
}

TEST_F(AddinCommandTest, EveryRefusalGivesItsMessageAndExitCodeAndChangesNoFile) {
  const std::map<String, String> Before = Files();
  struct TCase {
    std::vector<String> Args;
    int Code;
    String Message;
  };
  const std::vector<TCase> Cases{
      {{"get", "Panel1.Nope"}, feFailed, "formkit addin: Panel1 has no property 'Nope'\n"},
      {{"get", "Nope.Caption"}, feFailed, "formkit addin: The module has no component named 'Nope'\n"},
      {{"set", "Button1.Font", "x"}, feFailed, "formkit addin: Property Button1.Font cannot be set by an add-in\n"},
      {{"set", "Button1.OnClick", "x"}, feFailed,
       "formkit addin: Property Button1.OnClick cannot be set by an add-in\n"},
      {{"set", "Button1.Left", "abc"}, feFailed, "formkit addin: 'abc' is not a valid value for Button1.Left\n"},
      {{"set", "Button1.Left", "99999999999"}, feFailed,
       "formkit addin: '99999999999' is not a valid value for Button1.Left\n"},
      {{"set", "Panel1.Align", "alWrong"}, feFailed,
       "formkit addin: 'alWrong' is not a valid value for Panel1.Align\n"},
      {{"set", "Button1.Name", "1bad"}, feFailed, "formkit addin: '1bad' is not a valid component name\n"},
      {{"set", "Button1.Name", "Button2"}, feFailed,
       "formkit addin: A component named Button2 already exists\n"},
      {{"create", "TNoSuch"}, feFailed, "formkit addin: Cannot create a component of class 'TNoSuch'\n"},
      {{"create", "TFont"}, feFailed, "formkit addin: Cannot create a component of class 'TFont'\n"},
      {{"create", "TButton", "Nope"}, feFailed, "formkit addin: The module has no component named 'Nope'\n"},
      {{"delete", "Form1"}, feFailed,
       "formkit addin: Form1 cannot be deleted: the module's form does not own it\n"},
      {{"delete", "Nope"}, feFailed, "formkit addin: The module has no component named 'Nope'\n"},
      {{"frob"}, feUsage, "Unknown action 'frob' of 'formkit addin'. Try 'formkit addin --help'.\n"},
      {{"get", "Button1"}, feUsage, "'formkit addin get' needs NAME.PROP. Try 'formkit addin --help'.\n"},
      {{"get"}, feUsage, "'formkit addin get' needs NAME.PROP. Try 'formkit addin --help'.\n"},
      {{"set", "Button1.Caption"}, feUsage,
       "'formkit addin set' needs NAME.PROP VALUE. Try 'formkit addin --help'.\n"},
      {{"list", "extra"}, feUsage,
       "Unexpected argument 'extra' of 'formkit addin list'. Try 'formkit addin --help'.\n"},
      {{"delete", "Button1", "Button2"}, feUsage,
       "Unexpected argument 'Button2' of 'formkit addin delete'. Try 'formkit addin --help'.\n"},
  };
  for (const TCase& C : Cases) {
    EXPECT_EQ(Addin(C.Args), C.Code) << C.Args[0];
    EXPECT_EQ(Err.str(), C.Message);
    EXPECT_EQ(Out.str(), "");
    EXPECT_EQ(Files(), Before) << Err.str();
  }

  // The file and the action themselves.
  std::vector<String> Args{"addin", Form1()};
  Out.str("");
  Err.str("");
  EXPECT_EQ(RunFormkit(Args, Out, Err), feUsage);
  EXPECT_EQ(Err.str(), "'formkit addin' needs FILE list | get NAME.PROP | set NAME.PROP VALUE | create CLASS "
                       "[PARENT] | delete NAME. Try 'formkit addin --help'.\n");
  Out.str("");
  Err.str("");
  EXPECT_EQ(RunFormkit({"addin", (Dir / "Nope.kfm").string(), "list"}, Out, Err), feFailed);
  EXPECT_EQ(Err.str(), "formkit addin: Module " + (Dir / "Nope.kfm").string() + " not found\n");
  EXPECT_EQ(Files(), Before);
}

TEST_F(AddinCommandTest, HelpNamesTheActions) {
  std::ostringstream HelpOut, HelpErr;
  ASSERT_EQ(RunFormkit({"addin", "--help"}, HelpOut, HelpErr), feOK);
  EXPECT_EQ(HelpOut.str().rfind("Usage: formkit addin FILE list | get NAME.PROP | set NAME.PROP VALUE | create "
                                "CLASS [PARENT] | delete NAME\n\nLists and edits the module's components",
                                0),
            0u)
      << HelpOut.str();
  std::ostringstream MainOut, MainErr;
  ASSERT_EQ(RunFormkit({"--help"}, MainOut, MainErr), feOK);
  EXPECT_NE(MainOut.str().find("  addin FILE ACTION ARGUMENTS... lists and edits components as an add-in does\n"),
            String::npos);
}

} // namespace
