//===- tests/desktop/DesktopDialogsTest.cpp - Dialogs during a load ------===//
#include "tests/desktop/DesktopTestWindows.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

class DesktopDialogs : public DesktopTest {
protected:
  void TearDown() override {
    DialogsUnlockDrawing = DialogsStyled = DialogsTitleBar = true;
    DesktopTest::TearDown();
  }
};

TEST_F(DesktopDialogs, MessagesThawDrawingWhileTheyAreUp) {
  auto* W = MakeWindow<TPaneWindow>("W");
  W->Show();
  TIDEDesktopService::LockDrawing();
  DialogScript().Answer(mrNo);
  EXPECT_EQ(TIDEDialogsService::MessageDlg("Save changes?", mtConfirmation, {mbYes, mbNo, mbCancel}, 0, mbNo), mrNo);
  EXPECT_TRUE(W->UnlockMessagePosted()) << "drawing was thawed for the dialog";
  EXPECT_EQ(W->DrawingLockCount(), 1) << "and frozen again after it";
  EXPECT_TRUE(TIDEDesktopService::IsDrawingLocked());

  ASSERT_EQ(DialogScript().Shown().size(), 1u);
  const TShownDialog& D = DialogScript().Shown().back();
  EXPECT_EQ(D.Kind, "MessageDlg");
  EXPECT_EQ(D.Caption, "Confirmation");
  EXPECT_EQ(D.Message, "Save changes?");
  EXPECT_EQ(D.Buttons, (std::vector<String>{"Yes", "No", "Cancel"}));
  EXPECT_EQ(D.DefaultButton, "No");
  EXPECT_EQ(D.Bounds, Bounds(823, 465, 273, 109)) << "centred on the screen";
  EXPECT_EQ(D.ButtonParents, (std::vector<String>{"pnBottomButtons", "pnBottomButtons", "pnBottomButtons"}));
  // Right-aligned on the bottom panel, 8 pixels apart and from the edge.
  ASSERT_EQ(D.ButtonBounds.size(), 3u);
  EXPECT_EQ(D.ButtonBounds[2].Right, D.Bounds.Right - 8 - 8);
  EXPECT_EQ(D.ButtonBounds[1].Right, D.ButtonBounds[2].Left - 8);
  EXPECT_EQ(D.ButtonBounds[0].Right, D.ButtonBounds[1].Left - 8);

  // No answer: the exception passes, drawing is frozen again and nothing leaks.
  try {
    (void)TIDEDialogsService::MessageDlg("Really?", mtWarning, {mbOK}, 0);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "No answer is scripted for the dialog \"Warning\"");
  }
  EXPECT_EQ(W->DrawingLockCount(), 1);

  // Without the thaw option the drawing stays frozen throughout.
  ProcessMessages();
  TIDEDesktopService::LockDrawing();
  DialogsUnlockDrawing = false;
  DialogScript().Answer(mrOk);
  TIDEDialogsService::ShowMessage("Done");
  EXPECT_FALSE(W->UnlockMessagePosted());
  EXPECT_EQ(DialogScript().Shown().back().Caption, "");
  EXPECT_EQ(DialogScript().Shown().back().Buttons, (std::vector<String>{"OK"}));

  // The plain dialog, at a given position.
  DialogsStyled = DialogsTitleBar = false;
  DialogScript().Answer(mrRetry);
  EXPECT_EQ(TIDEDialogsService::MessageDlgPos("Disk full", mtError, {mbAbort, mbRetry, mbIgnore}, 0, 100, 50, mbRetry),
            mrRetry);
  const TShownDialog& Plain = DialogScript().Shown().back();
  EXPECT_EQ(Plain.Caption, "Error");
  EXPECT_EQ(Plain.Bounds.TopLeft(), Point(100, 50));
  EXPECT_EQ(Plain.ButtonParents, (std::vector<String>{"", "", ""})) << "the buttons stand on the form";
  EXPECT_EQ(Plain.DefaultButton, "Retry");
}

TEST_F(DesktopDialogs, InputQueriesCloseOnlyWhenTheValuesAreAccepted) {
  DialogScript().Answer(mrOk, {"no spaces allowed"});
  DialogScript().Answer(mrOk, {"Renamed"});
  std::vector<String> Values{"Form1"};
  auto NoSpaces = [](const std::vector<String>& V) { return V[0].find(' ') == String::npos; };
  EXPECT_TRUE(TIDEDialogsService::InputQuery("Rename", {"New name:"}, Values, NoSpaces));
  EXPECT_EQ(Values, (std::vector<String>{"Renamed"}));
  ASSERT_EQ(DialogScript().Shown().size(), 2u) << "the refused value kept the dialog open";
  EXPECT_EQ(DialogScript().Shown()[0].Values, (std::vector<String>{"Form1"}));
  EXPECT_EQ(DialogScript().Shown()[0].Prompts, (std::vector<String>{"New name:"}));

  DialogScript().Answer(mrCancel);
  EXPECT_EQ(TIDEDialogsService::InputBox("Find", "Text:", "needle"), "needle");
  DialogScript().Answer(mrOk, {"haystack"});
  EXPECT_EQ(TIDEDialogsService::InputBox("Find", "Text:", "needle"), "haystack");
  String One = "a";
  DialogScript().Answer(mrCancel);
  EXPECT_FALSE(TIDEDialogsService::InputQuery("Find", "Text:", One));
  EXPECT_EQ(One, "a");
}

} // namespace
