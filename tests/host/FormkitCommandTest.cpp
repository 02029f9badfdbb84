//===- tests/host/FormkitCommandTest.cpp - The formkit command on the examples ===//
//
// Each subcommand run on a copy of the examples in a scratch directory, with its
// output, its messages and its exit code asserted; the demo script's results
// reopened; and every kind of bad input refused with one message, a non-zero
// exit and no file changed.
//
//===----------------------------------------------------------------------===//
#include "host/DesignHost.h"
#include "tests/host/ExamplesFixture.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>

using namespace formkit;

namespace {

namespace fs = std::filesystem;

using FormkitCommandTest = hosttest::ExamplesFixture;

TEST_F(FormkitCommandTest, TreePrintsTheStructureTreeWithCollectionsAndNestedFramesWithTheirOwn) {
  // Controls stand under their parents, the frame's own components under the frame, the
  // status bar's panels as a collection node under it; the captions name the classes.
  ASSERT_EQ(Run({"tree", At("Form2.kfm")}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Form2 (TForm2)\n"
                       "  Panel1 (TPanel)\n"
                       "    CheckBox1 (TCheckBox)\n"
                       "    Edit1 (TEdit)\n"
                       "    Label1 (TLabel)\n"
                       "  Frame11 (TFrame1)\n"
                       "    Label1 (TLabel)\n"
                       "    Edit1 (TEdit)\n"
                       "  Button1 (TButton)\n"
                       "  Button2 (TButton)\n"
                       "  StatusBar1 (TStatusBar)\n"
                       "    Panels (TStatusPanels)\n"
                       "  Timer1 (TTimer)\n");
  EXPECT_EQ(Err.str(), "");
}

TEST_F(FormkitCommandTest, PropsShowsTheInspectorsListAndSetWritesThroughTheEditor) {
  ASSERT_EQ(Run({"props", At("Form1.kfm"), "Button1"}), feOK) << Err.str();
  EXPECT_NE(Out.str().find("Caption\tOK\tpaMultiSelect,paAutoUpdate,paRevertable\n"), String::npos) << Out.str();
  EXPECT_NE(Out.str().find("Left\t296\tpaMultiSelect,paRevertable\n"), String::npos) << Out.str();
  EXPECT_NE(Out.str().find("OnClick\t\tpaValueList,paMultiSelect,paSortList,paRevertable\n"), String::npos) << Out.str();

  ASSERT_EQ(Run({"set", At("Form1.kfm"), "Button1.Caption", "Done"}), feOK) << Err.str();
  ASSERT_EQ(Run({"props", At("Form1.kfm"), "Button1"}), feOK);
  EXPECT_NE(Out.str().find("Caption\tDone\t"), String::npos);
  // The descendant that did not override the caption shows it too when it opens.
  ASSERT_EQ(Run({"props", At("Form2.kfm"), "Button2"}), feOK);
  EXPECT_NE(Out.str().find("Caption\tCancel\t"), String::npos);
}

TEST_F(FormkitCommandTest, ConvertNewAndAnUneditedSaveKeepWhatTheyShould) {
  String Text = Read(At("Frame1.kfm"));
  ASSERT_EQ(Run({"convert", At("Frame1.kfm"), "--binary"}), feOK) << Err.str();
  EXPECT_EQ(Read(At("Frame1.kfm")).substr(0, 1), String(1, '\xFF')) << "a resource header";
  ASSERT_EQ(Run({"convert", At("Frame1.kfm"), "--text"}), feOK) << Err.str();
  EXPECT_EQ(Read(At("Frame1.kfm")), Text) << "back to the same text";

  ASSERT_EQ(Run({"new", At("Form3.kfm"), "--inherit", "Form2"}), feOK) << Err.str();
  EXPECT_EQ(Read(At("Form3.fks")), "class TForm3 : TForm2\n");
  ASSERT_EQ(Run({"tree", At("Form3.kfm")}), feOK) << Err.str();
  EXPECT_EQ(Out.str().substr(0, 33), "Form3 (TForm3)\n  Panel1 (TPanel)\n");
}

TEST_F(FormkitCommandTest, TheDemoDesignsByHandAndItsFilesReopenAsTheyWereLeft) {
  String Frame = Read(At("Frame1.kfm"));
  fs::current_path(Dir);
  ASSERT_EQ(Run({"run", At("demo.design")}), feOK) << Err.str();
  EXPECT_NE(Out.str().find("14: bind Button3.OnClick HelpClick\n"), String::npos) << Out.str();
  // The handler is in the source; the descendant has the ancestor's new button and caption.
  EXPECT_NE(Read(At("Form1.fks")).find("handler HelpClick(Sender: TObject)\nbegin\nend\n"), String::npos);
  EXPECT_NE(Read(At("Form1.fks")).find("  field Button3: TButton\n"), String::npos);
  EXPECT_EQ(Read(At("Form2.fks")).find("Button3"), String::npos) << "an inherited name is no field of its own";
  ASSERT_EQ(Run({"props", At("Form2.kfm"), "Button2"}), feOK);
  EXPECT_NE(Out.str().find("Caption\tClose\t"), String::npos);
  ASSERT_EQ(Run({"props", At("Form2.kfm"), "Button3"}), feOK) << Err.str();
  EXPECT_NE(Out.str().find("OnClick\tHelpClick\t"), String::npos);
  EXPECT_EQ(Read(At("Frame1.kfm")), Frame) << "opened and saved without an edit: the same bytes";
}

TEST_F(FormkitCommandTest, RenderDrawsTheModuleAtItsSizeWithTheSelection) {
  ASSERT_EQ(Run({"render", At("Form1.kfm"), At("Form1.png"), "--select", "Button1", "Label1"}), feOK) << Err.str();
  String Png = Read(At("Form1.png"));
  ASSERT_GT(Png.size(), 24u);
  EXPECT_EQ(Png.substr(1, 3), "PNG");
  auto BigEndian = [&](std::size_t At) {
    return (unsigned(std::uint8_t(Png[At])) << 24) | (unsigned(std::uint8_t(Png[At + 1])) << 16) |
           (unsigned(std::uint8_t(Png[At + 2])) << 8) | unsigned(std::uint8_t(Png[At + 3]));
  };
  EXPECT_EQ(BigEndian(16), 480u) << "the form's client width";
  EXPECT_EQ(BigEndian(20), 320u) << "the form's client height";
  ASSERT_EQ(Run({"render", At("Form1.kfm"), At("Form1.svg")}), feOK) << Err.str();
  EXPECT_NE(Read(At("Form1.svg")).find("<g id=\"Button1\" class=\"TButton\""), String::npos);
  EXPECT_EQ(Run({"render", At("Form1.kfm"), At("Form1.bmp")}), feFailed);
  EXPECT_EQ(Err.str(), "formkit render: Cannot render to \"" + At("Form1.bmp") +
                           "\": the file name must end in .png or .svg\n");
  EXPECT_FALSE(fs::exists(At("Form1.bmp")));
}

TEST_F(FormkitCommandTest, ScriptsLineUpSizeAndMirrorTheSelection) {
  WriteScript("line.design", "open " + At("Form1.kfm") +
                                 "\nselect Button2 Button1\n"
                                 "align top\n"
                                 "align hspacedel\n"
                                 "expect Button1.Left 309\n"
                                 "size habsolute 60\n"
                                 "expect Button1.Width 60\n"
                                 "flip all\n"
                                 "expect Button2.Left 36\n"
                                 "save\n"
                                 "align diagonal\n");
  auto Before = Files();
  EXPECT_EQ(Run({"run", At("line.design")}), feFailed);
  EXPECT_EQ(Err.str(), "formkit run: " + At("line.design") + ":11: unknown way 'diagonal'\n");
  EXPECT_NE(Out.str().find("9: expect Button2.Left 36\n"), String::npos) << Out.str();
  EXPECT_EQ(Files(), Before) << "the save of line 10 was taken back";
}

TEST_F(FormkitCommandTest, HelpAndUsageErrorsExitWithTwo) {
  EXPECT_EQ(Run({"--help"}), feOK);
  EXPECT_NE(Out.str().find("Exit codes: 0 done;"), String::npos);
  EXPECT_EQ(Run({"set", "--help"}), feOK);
  EXPECT_EQ(Out.str().substr(0, 41), "Usage: formkit set FILE NAME.PROP VALUE\n\n");
  EXPECT_EQ(Run({}), feUsage);
  EXPECT_EQ(Run({"draw"}), feUsage);
  EXPECT_EQ(Err.str(), "Unknown subcommand 'draw'. Try 'formkit --help'.\n");
  EXPECT_EQ(Run({"convert", At("Form1.kfm"), "--pdf"}), feUsage);
  EXPECT_EQ(Err.str(), "Unknown option '--pdf' of 'formkit convert'. Try 'formkit convert --help'.\n");
  EXPECT_EQ(Run({"props", At("Form1.kfm")}), feUsage);
  EXPECT_EQ(Err.str(), "'formkit props' needs FILE NAME. Try 'formkit props --help'.\n");
}

TEST_F(FormkitCommandTest, BadInputIsRefusedWithOneMessageAndNoFileChanges) {
  WriteScript("bad.design", "open Form1.kfm\nset Button1.Caption Changed\nsave\nfrobnicate\n");
  std::ofstream(At("Broken.kfm")) << "object Broken: TForm\n  Caption = \n";
  auto Before = Files();
  fs::current_path(Dir);
  struct TCase {
    std::vector<String> Args;
    String Message;
  };
  std::vector<TCase> Cases{
      {{"tree", At("Missing.kfm")}, "formkit tree: Module " + At("Missing.kfm") + " not found\n"},
      {{"tree", At("Broken.kfm")}, "formkit tree: Line 3: value expected\n"},
      {{"set", At("Form1.kfm"), "Button1.Colour", "clRed"}, "formkit set: Component Button1 has no property 'Colour'\n"},
      {{"set", At("Form1.kfm"), "Button9.Caption", "x"}, "formkit set: Module Form1 has no component named 'Button9'\n"},
      {{"set", At("Form1.kfm"), "Button1.Left", "wide"}, "formkit set: 'wide' is not a valid integer value\n"},
      {{"set", At("Form1.kfm"), "Caption", "x"}, "formkit set: 'Caption' is not of the form NAME.PROPERTY\n"},
      {{"run", At("bad.design")}, "formkit run: " + At("bad.design") + ":4: unknown step 'frobnicate'\n"},
  };
  for (const TCase& Case : Cases) {
    SCOPED_TRACE(Case.Args[0] + " " + Case.Args.back());
    EXPECT_EQ(Run(Case.Args), feFailed);
    EXPECT_EQ(Err.str(), Case.Message);
    EXPECT_EQ(Files(), Before) << "a file changed";
  }
}

} // namespace

//===----------------------------------------------------------------------===//
// Positioning and views
//===----------------------------------------------------------------------===//

namespace {

struct ArrangeCommandTest : FormkitCommandTest {
  /// What `props` shows for `Component`.`Property` of `File`.
  String Prop(const String& File, const String& Component, const String& Property) {
    EXPECT_EQ(Run({"props", At(File), Component}), feOK) << Err.str();
    std::istringstream Lines(Out.str());
    for (String Line; std::getline(Lines, Line);) {
      if (Line.rfind(Property + "\t", 0) != 0) continue;
      String Rest = Line.substr(Property.size() + 1);
      return Rest.substr(0, Rest.find('\t'));
    }
    return "?";
  }
};

TEST_F(ArrangeCommandTest, AlignSizeFlipAndRevertChangeTheModuleAndSaveIt) {
  // Button2 (384, 280) is the anchor: Button1 (296, 280) moves to its left edge.
  ASSERT_EQ(Run({"align", At("Form1.kfm"), "left", "Button2", "Button1"}), feOK) << Err.str();
  EXPECT_EQ(Prop("Form1.kfm", "Button1", "Left"), "384");
  ASSERT_EQ(Run({"size", At("Form1.kfm"), "habsolute", "Button1", "Button2", "--to", "90"}), feOK) << Err.str();
  EXPECT_EQ(Prop("Form1.kfm", "Button1", "Width"), "90");
  EXPECT_EQ(Prop("Form1.kfm", "Button2", "Width"), "90");
  // Mirrored in the form's client width of 480.
  ASSERT_EQ(Run({"flip", At("Form1.kfm"), "--all"}), feOK) << Err.str();
  EXPECT_EQ(Prop("Form1.kfm", "Button1", "Left"), "6");

  // An inherited component given back its ancestor's caption.
  String Inherited = Prop("Form1.kfm", "Button2", "Caption");
  ASSERT_EQ(Run({"set", At("Form2.kfm"), "Button2.Caption", "Mine"}), feOK) << Err.str();
  ASSERT_EQ(Run({"revert", At("Form2.kfm"), "Button2"}), feOK) << Err.str();
  EXPECT_EQ(Prop("Form2.kfm", "Button2", "Caption"), Inherited);

  // Refused: nothing changes, with the message and the exit code.
  std::map<String, String> Before = Files();
  EXPECT_EQ(Run({"align", At("Form1.kfm"), "sideways", "Button1", "Button2"}), feFailed);
  EXPECT_EQ(Err.str(), "formkit align: unknown way 'sideways'\n");
  EXPECT_EQ(Run({"align", At("Form1.kfm"), "left", "Button1", "Nobody"}), feFailed);
  EXPECT_EQ(Err.str(), "formkit align: Module Form1 has no component named 'Nobody'\n");
  EXPECT_EQ(Run({"size", At("Form1.kfm"), "habsolute", "Button1", "--to"}), feUsage);
  EXPECT_EQ(Run({"flip", At("Form1.kfm"), "Panel1", "--all"}), feUsage);
  EXPECT_EQ(Err.str(), "Unknown option '--all' of 'formkit flip'. Try 'formkit flip --help'.\n");
  EXPECT_EQ(Run({"revert", At("Form2.kfm")}), feUsage);
  EXPECT_EQ(Files(), Before);
}

TEST_F(ArrangeCommandTest, ViewsAreAddedSavedBesideTheModuleListedAndRemoved) {
  ASSERT_EQ(Run({"views", At("Form1.kfm"), "--add", "Phone", "--add", "Tall"}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Phone\t360x640\tForm1.Phone.kfm\nTall\t-\tForm1.Tall.kfm\n");
  EXPECT_TRUE(fs::exists(At("Form1.Phone.kfm")));
  EXPECT_NE(Read(At("Form1.fks")).find("  view Phone=360x640\n  view Tall=\n"), String::npos) << Read(At("Form1.fks"));

  // A script moves a button in one view; the master's edit reaches the view.
  WriteScript("views.design", "open " + At("Form1.kfm") + "\n"
                              "view show Tall\n"
                              "set Button1.Left 10\n"
                              "view show master\n"
                              "set Button1.Caption Go\n"
                              "view show tall\n"
                              "expect Button1.Caption Go\n"
                              "save\n");
  ASSERT_EQ(Run({"run", At("views.design")}), feOK) << Err.str();
  EXPECT_EQ(Prop("Form1.kfm", "Button1", "Left"), "296");
  EXPECT_EQ(Prop("Form1.kfm", "Button1", "Caption"), "Go");

  std::map<String, String> Before = Files();
  EXPECT_EQ(Run({"views", At("Form1.kfm"), "--add", "tall"}), feFailed);
  EXPECT_EQ(Err.str(), "formkit views: View \"tall\" already exists in module\n");
  EXPECT_EQ(Run({"views", At("Form1.kfm"), "--remove", "Wide"}), feFailed);
  EXPECT_EQ(Err.str(), "formkit views: View \"Wide\" does not exist in module\n");
  EXPECT_EQ(Run({"views", At("Form1.kfm"), "--add"}), feUsage);
  EXPECT_EQ(Files(), Before);

  ASSERT_EQ(Run({"views", At("Form1.kfm"), "--remove", "phone"}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Tall\t-\tForm1.Tall.kfm\n");
  ASSERT_EQ(Run({"views", At("Form1.kfm")}), feOK) << Err.str();
  EXPECT_EQ(Out.str(), "Tall\t-\tForm1.Tall.kfm\n");
}

} // namespace

namespace {

TEST_F(ArrangeCommandTest, AComponentDroppedOnANestedFrameBelongsToTheFrameAndIsSavedWithIt) {
  // Frame11 stands at (8, 128) on Form1; the click at (300, 140) lands inside it.
  WriteScript("frame.design", "open " + At("Form1.kfm") + "\n"
                              "create TButton 300 140\n"
                              "set Frame11.Button3.Caption Inside\n"
                              "save\n");
  ASSERT_EQ(Run({"run", At("frame.design")}), feOK) << Err.str();
  EXPECT_EQ(Prop("Form1.kfm", "Frame11.Button3", "Caption"), "Inside");
  EXPECT_EQ(Prop("Form1.kfm", "Frame11.Button3", "Left"), "296");
  ASSERT_EQ(Run({"tree", At("Form1.kfm")}), feOK) << Err.str();
  EXPECT_NE(Out.str().find("  Frame11 (TFrame1)\n    Label1 (TLabel)\n    Edit1 (TEdit)\n    Button3 (TButton)\n"),
            String::npos)
      << Out.str();
}

} // namespace

namespace formkit::hosttest {
namespace {

// A nested frame is a new child of a form without ancestor, like any other: the children
// after it keep their places without positions in the file.
TEST_F(ExamplesFixture, FormWithNestedFrameSavesWithoutChildPositions) {
  ASSERT_EQ(Run({"set", At("Form1.kfm"), "Button1.Caption", "Yes"}), feOK) << Err.str();
  String Saved = Read(Dir / "Form1.kfm");
  EXPECT_NE(Saved.find("  object Button1: TButton\n"), String::npos) << Saved;
  EXPECT_EQ(Saved.find(": TTimer ["), String::npos) << Saved;
  ASSERT_EQ(Run({"tree", At("Form1.kfm")}), feOK) << Err.str();
  EXPECT_NE(Out.str().find("  Frame11 (TFrame1)\n    Label1 (TLabel)\n    Edit1 (TEdit)\n  Button1 (TButton)\n"),
            String::npos)
      << Out.str();
}

} // namespace
} // namespace formkit::hosttest
