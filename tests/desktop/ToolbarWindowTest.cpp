//===- tests/desktop/ToolbarWindowTest.cpp - Design windows with a bar ---===//
#include "tests/desktop/DesktopTestSupport.h"

#include "desktop/ToolWnds.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

using ToolbarWindows = DesktopTest;

/// Height, button height and width, captions and hints of a tool bar.
std::vector<int> BarOf(TToolBar* Bar) {
  return {Bar->Height(), Bar->ButtonHeight(), Bar->ButtonWidth(), Bar->ShowCaptions(), Bar->ShowHint()};
}

TEST_F(ToolbarWindows, TwoSizesSwitchedByCommandsAndSnappedBySplitter) {
  auto* W = CreateComponentOf<TToolbarDesignWindow>(Application());
  Vars["W"] = W;
  W->SetBounds(0, 0, 400, 300);
  TToolBar* Bar = W->ToolBar1();
  TSplitter* Splitter = W->Splitter1();
  EXPECT_EQ(W->Caption(), "ToolbarForm");
  EXPECT_EQ(W->SmallToolbarHeight(), 32);
  EXPECT_EQ(W->LargeToolbarHeight(), 44) << "8 and a row of large buttons";
  EXPECT_EQ(BarOf(Bar), (std::vector<int>{32, 24, 24, false, true}));
  EXPECT_EQ(Splitter->Top(), Bar->Top() + Bar->Height()) << "directly below the bar";
  EXPECT_EQ(Splitter->Height(), 8);
  EXPECT_EQ(Splitter->Cursor(), crSizeNS);
  EXPECT_TRUE(RedrawEnabled(Bar));

  // The text labels command, through the bar's popup menu.
  TMenuItem* Labels = W->PopupMenu2()->Items()->Items(0);
  EXPECT_EQ(Labels->Caption(), "Text &Labels");
  Labels->Click();
  EXPECT_TRUE(W->LargeButtons());
  EXPECT_EQ(BarOf(Bar), (std::vector<int>{44, 36, 56, true, false}));
  W->ActionList1()->UpdateActions();
  EXPECT_TRUE(Labels->Checked());

  // The splitter snaps the bar to one of its heights and switches the labels with it.
  EXPECT_TRUE(Splitter->MoveTo(40));
  EXPECT_EQ(Bar->Height(), 44) << "not dragged down to the small height: stays large";
  EXPECT_TRUE(Splitter->MoveTo(20));
  EXPECT_FALSE(W->LargeButtons());
  EXPECT_EQ(BarOf(Bar), (std::vector<int>{32, 24, 24, false, true}));
  EXPECT_TRUE(Splitter->MoveTo(40));
  EXPECT_FALSE(W->LargeButtons()) << "not dragged to the large height: stays small";
  EXPECT_TRUE(Splitter->MoveTo(90));
  EXPECT_TRUE(W->LargeButtons());
  EXPECT_EQ(Bar->Height(), 44);
  EXPECT_EQ(Splitter->Top(), 44);

  // The tool bar command, through the window's popup menu: the splitter goes with the bar.
  TMenuItem* Toolbar = W->PopupMenu1()->Items()->Items(0);
  EXPECT_EQ(Toolbar->Caption(), "&Toolbar");
  Toolbar->Click();
  EXPECT_FALSE(Bar->Visible());
  EXPECT_FALSE(Splitter->Visible());
  W->ActionList1()->UpdateActions();
  EXPECT_FALSE(Toolbar->Checked());
  Toolbar->Click();
  EXPECT_TRUE(Bar->Visible());
  EXPECT_TRUE(Splitter->Visible());
  EXPECT_EQ(Splitter->Top(), Bar->Top() + Bar->Height());
  W->ActionList1()->UpdateActions();
  EXPECT_TRUE(Toolbar->Checked());

  // Help by context, else by keyword; without either the command is off.
  TAction* Help = W->HelpCmd();
  EXPECT_EQ(Help->Hint(), "Show help");
  W->ActionList1()->UpdateActions();
  EXPECT_FALSE(Help->Enabled());
  EXPECT_FALSE(Help->Execute());
  W->SetHelpKeyword("ItemsEditor");
  W->ActionList1()->UpdateActions();
  EXPECT_TRUE(Help->Execute());
  W->SetHelpContext(1207);
  W->ActionList1()->UpdateActions();
  EXPECT_TRUE(Help->Execute());
  W->SetHelpType(htKeyword);
  W->ActionList1()->UpdateActions();
  EXPECT_TRUE(Help->Execute());
  EXPECT_EQ(Application()->HelpRequests(),
            (std::vector<String>{"keyword ItemsEditor", "context 1207", "keyword ItemsEditor"}));

  // At twice the resolution the sizes scale, and the snapping with them.
  W->ScaleForPPI(192);
  W->ResizeButtons(true);
  EXPECT_EQ(BarOf(Bar), (std::vector<int>{88, 72, 112, true, false}));
  EXPECT_TRUE(Splitter->MoveTo(80));
  EXPECT_EQ(Bar->Height(), 88);
  EXPECT_TRUE(Splitter->MoveTo(50));
  EXPECT_EQ(BarOf(Bar), (std::vector<int>{64, 48, 48, false, true}));
}

} // namespace
