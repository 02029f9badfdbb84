//===- tests/desktop/KilnWindowsTest.cpp - Placement, docking, focus -----===//
#include "tests/desktop/DesktopTestWindows.h"

#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnSplitters.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

using KilnWindows = DesktopTest;

TEST_F(KilnWindows, StatesAndPlacementsKeepTheRestoredRectangle) {
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 40, 1920, 1080), 96, true},
                         {Rect(1920, 0, 3200, 1024), Rect(1920, 0, 3200, 984), 96, false}});
  auto* F = MakeWindow<TPaneWindow>("F");
  F->SetBounds(2000, 100, 400, 300);
  F->Show();
  F->SetWindowState(wsMaximized);
  EXPECT_EQ(F->BoundsRect(), Rect(1920, 0, 3200, 984)) << "the work area of its own monitor";
  EXPECT_EQ(F->RestoredBounds(), Rect(2000, 100, 2400, 400));
  TWindowPlacement P = F->Placement();
  EXPECT_EQ(P.showCmd, SW_SHOWMAXIMIZED);
  EXPECT_EQ(P.rcNormalPosition, Rect(2000, 100, 2400, 400)) << "no offset on a monitor whose work area starts at its corner";
  F->SetWindowState(wsNormal);
  EXPECT_EQ(F->BoundsRect(), Rect(2000, 100, 2400, 400));

  // Workspace coordinates on the primary, whose work area starts 40 pixels down.
  P.rcNormalPosition = Rect(10, 10, 410, 310);
  P.showCmd = SW_MINIMIZE;
  P.ptMaxPosition = Point(-8, -8);
  F->SetPlacement(P);
  EXPECT_EQ(F->WindowState(), wsMinimized);
  EXPECT_EQ(F->RestoredBounds(), Rect(10, 50, 410, 350));
  EXPECT_EQ(F->Placement().rcNormalPosition, Rect(10, 10, 410, 310));
  EXPECT_EQ(F->Placement().ptMaxPosition, Point(-8, -8));
  P.showCmd = SW_HIDE;
  F->SetPlacement(P);
  EXPECT_FALSE(F->Visible());
  EXPECT_EQ(F->Placement().showCmd, SW_HIDE);

  // Bad placements change nothing.
  TWindowPlacement Bad = P;
  Bad.length = 40;
  Bad.rcNormalPosition = Rect(0, 0, 1, 1);
  try {
    F->SetPlacement(Bad);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "A window placement must declare a length of 44, not 40");
  }
  Bad.length = 44;
  Bad.showCmd = 12;
  try {
    F->SetPlacement(Bad);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Unknown show command 12");
  }
  EXPECT_EQ(F->RestoredBounds(), Rect(10, 50, 410, 350));
  EXPECT_THROW(ShowWindow(F, 12), EInvalidOperation);
  EXPECT_EQ(ScreenToWorkspace(Rect(2000, 10, 2100, 20)), Rect(2000, 10, 2100, 20));
  EXPECT_EQ(WorkspaceToScreen(Rect(5, 5, 6, 6)), Rect(5, 45, 6, 46));
}

TEST_F(KilnWindows, DockSitesFocusAndTheApplication) {
  auto* Site = MakeWindow<TPaneWindow>("Site");
  auto* A = MakeWindow<TPaneWindow>("A");
  auto* B = MakeWindow<TPaneWindow>("B");
  try {
    ManualDock(A, Site);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "TPaneWindow is not a dock site");
  }
  EXPECT_EQ(A->Parent(), nullptr) << "nothing changed";
  SetDockSite(Site, true);
  Site->SetName("Site");
  ManualDock(A, Site);
  ManualDock(B, Site);
  ManualDock(A, Site);
  EXPECT_EQ(DockClients(Site), (std::vector<TControl*>{A, B}));
  EXPECT_THROW(ManualDock(Site, Site), EInvalidOperation);
  SetDockSite(A, true);
  ManualDock(B, A);
  EXPECT_EQ(DockClients(Site), (std::vector<TControl*>{A})) << "out of one site into another";
  EXPECT_EQ(HostDockSite(B), A);
  try {
    ManualDock(Site, A);
    FAIL() << "a site cannot dock into its own client";
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Site cannot dock into TPaneWindow, which lies inside it");
  }
  ManualFloat(B, Rect(100, 100, 300, 200));
  EXPECT_EQ(HostDockSite(B), nullptr);
  EXPECT_EQ(B->BoundsRect(), Rect(100, 100, 300, 200));
  EXPECT_TRUE(DockClients(A).empty());
  // A site that goes takes its clients; a client that goes leaves its site.
  ManualDock(B, Site);
  B->Destroy();
  Vars["B"] = nullptr;
  EXPECT_EQ(DockClients(Site), (std::vector<TControl*>{A}));

  auto* Panel = CreateComponentOf<TPanel>(A);
  Panel->SetParent(A);
  SetFocus(Panel);
  EXPECT_EQ(GetFocus(), Panel);
  EXPECT_EQ(Screen()->ActiveForm(), nullptr) << "a hidden form is not activated";
  Site->Show();
  SetFocus(Panel);
  EXPECT_EQ(Screen()->ActiveForm(), Site) << "the focus activates the top-level form";
  Panel->Destroy();
  EXPECT_EQ(GetFocus(), nullptr) << "the focus leaves a control that goes";

  EXPECT_TRUE(RedrawEnabled(A));
  SetRedraw(A, false);
  EXPECT_FALSE(RedrawEnabled(A));
  RedrawWindow(Site);
  EXPECT_EQ(InvalidationCount(Site), 1);
  EXPECT_EQ(InvalidationCount(A), 1) << "with all its children";

  Application()->SetMainForm(Site);
  EXPECT_EQ(Application()->MainForm(), Site);
  Site->Destroy();
  Vars["Site"] = nullptr;
  EXPECT_EQ(Application()->MainForm(), nullptr);
}

TEST_F(KilnWindows, ActionsMenusAndSplittersHoldTogether) {
  struct TSink : TObject {
    int Runs = 0;
    void Run(TObject*) { ++Runs; }
    void Refuse(TObject*, int&, bool& Accept) { Accept = false; }
  } Sink;
  TObjectGuard<TComponent> Owner(CreateComponentOf<TComponent>(nullptr));
  auto* List = CreateComponentOf<TActionList>(Owner.Get());
  auto* Cmd = CreateComponentOf<TAction>(Owner.Get());
  Cmd->SetActionList(List);
  Cmd->SetCaption("&Run");
  auto* Item = CreateComponentOf<TMenuItem>(Owner.Get());
  auto* Sub = CreateComponentOf<TMenuItem>(Owner.Get());
  Item->Add(Sub);
  Sub->SetAction(Cmd);
  EXPECT_EQ(Sub->Caption(), "&Run");
  Sub->Click();
  EXPECT_EQ(Sink.Runs, 0) << "an action without a handler does nothing";
  Cmd->OnExecute = TNotifyEvent::Bind<&TSink::Run>(&Sink);
  Sub->Click();
  Cmd->SetEnabled(false);
  EXPECT_FALSE(Cmd->Execute());
  EXPECT_EQ(Sink.Runs, 1);
  try {
    Sub->Add(Item);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "A menu item cannot hold itself or an item above it");
  }
  EXPECT_THROW(Item->Items(1), EListError);
  EXPECT_THROW(List->Actions(-1), EListError);
  Cmd->Destroy();
  EXPECT_EQ(Sub->Action(), nullptr) << "an item forgets the action that goes";
  EXPECT_EQ(List->ActionCount(), 0);
  Item->Destroy();
  EXPECT_EQ(Sub->ParentItem(), nullptr);
  Sub->OnClick = TNotifyEvent::Bind<&TSink::Run>(&Sink);
  Sub->Click();
  EXPECT_EQ(Sink.Runs, 2);

  // A splitter beside nothing moves nothing; one that refuses keeps the size.
  auto* Form = MakeWindow<TPaneWindow>("Form");
  auto* Side = CreateComponentOf<TPanel>(Form);
  Side->SetAlign(alLeft);
  Side->SetWidth(100);
  Side->SetParent(Form);
  auto* Bar = CreateComponentOf<TSplitter>(Form);
  Bar->SetParent(Form);
  Bar->SetLeft(100);
  EXPECT_EQ(Bar->ResizeControl(), Side);
  EXPECT_TRUE(Bar->MoveTo(150));
  EXPECT_EQ(Side->Width(), 150);
  EXPECT_TRUE(Bar->MoveTo(10));
  EXPECT_EQ(Side->Width(), 30) << "no smaller than the minimum";
  Bar->OnCanResize = TCanResizeEvent::Bind<&TSink::Refuse>(&Sink);
  EXPECT_FALSE(Bar->MoveTo(200));
  EXPECT_EQ(Side->Width(), 30);
  Side->Hide();
  EXPECT_EQ(Bar->ResizeControl(), nullptr);
  EXPECT_FALSE(Bar->MoveTo(200));
}

} // namespace
