//===- tests/desktop/DesktopEdgeTest.cpp - Units, monitors, bad desktops -===//
#include "tests/desktop/DesktopTestWindows.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

using DesktopEdges = DesktopTest;



TEST_F(DesktopEdges, RelativeUnitsRoundWrapAndClip) {
  using S = TIDEDesktopService;
  EXPECT_EQ(S::ActualToRelative(960, 1920), 5000);
  EXPECT_EQ(S::ActualToRelative(944, 1920), 4917);
  EXPECT_EQ(S::ActualToRelative(-1, 1040), -10);
  EXPECT_EQ(S::ActualToRelative(300, 1920), 1562) << "a half rounds to the even neighbour";
  EXPECT_EQ(S::ActualToRelative(5, 0), 0) << "an empty range";
  EXPECT_EQ(S::RelativeToActual(7500, 3840), 2880);
  EXPECT_EQ(S::RelativeToActual(4167, 2560), 1067);
  EXPECT_EQ(S::RelativeToActual(2000000000, 1920), 29924) << "the product wraps in 32 bits";
  EXPECT_EQ(S::AdjustWidth(0, 321, true), 321);
  EXPECT_EQ(S::AdjustWidth(-1, 321, true), 321);
  EXPECT_EQ(S::AdjustWidth(5000, 321, true), 960);
  EXPECT_EQ(S::AdjustWidth(640, 321, false), 640) << "pixels stand";
  EXPECT_EQ(S::AdjustHeight(5000, 1, true), 520);

  // Positions come back clipped to the virtual desktop; sizes convert only above 0.
  int X = -3000, Y = 12000;
  TDesktopForm::DesktopPosRelativeToActual(X, Y);
  EXPECT_EQ(Point(X, Y), Point(0, 1080));
  int W = 0, H = 5000;
  TDesktopForm::DesktopSizeRelativeToActual(W, H);
  EXPECT_EQ(Point(W, H), Point(0, 520));
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true},
                         {Rect(-1280, -200, 0, 824), Rect(-1280, -200, 0, 784), 96, false}});
  X = -3000, Y = -500;
  TDesktopForm::DesktopPosRelativeToActual(X, Y);
  EXPECT_EQ(Point(X, Y), Point(-576, -52)) << "inside the virtual desktop, left of the primary";

  EXPECT_EQ(BinToHex({0x00, 0x7F, 0xAB, 0xFF}), "007FABFF");
  EXPECT_EQ(HexToBin("007fABff"), (std::vector<std::uint8_t>{0x00, 0x7F, 0xAB, 0xFF}));
  try {
    (void)HexToBin("4G");
    FAIL();
  } catch (const EConvertError& E) {
    EXPECT_STREQ(E.what(), "'4G' is not valid hexadecimal text");
  }
  EXPECT_THROW((void)HexToBin("ABC"), EConvertError);

  TToolbarMetrics M = ToolbarMetrics();
  EXPECT_EQ(M.SmallToolbarSize, 30);
  EXPECT_EQ(M.CaptionButtonWidth, 56);
  SetResStringOverride("SSmallToolbarSize", "thirty");
  SetResStringOverride("SLargeToolbarSize", "48");
  M = ToolbarMetrics();
  ClearResStringOverrides();
  EXPECT_EQ(M.SmallToolbarSize, 30) << "a text that is no number gives the built-in value";
  EXPECT_EQ(M.LargeToolbarSize, 48);
}

TEST_F(DesktopEdges, WindowsComeBackOnTheMonitorsOfTheMoment) {
  Register(TPaneWindow::StaticClass(), "Wide");
  auto* Wide = MakeWindow<TPaneWindow>("Wide");
  // Stored at three quarters, loaded on a wider primary.
  Screen()->SetMonitors({{Rect(0, 0, 3840, 2160), Rect(0, 0, 3840, 2120), 96, true}});
  auto Desktop = DesktopOf("[Wide]\nPercentageSizes=1\nCreate=1\nVisible=1\nLeft=7500\nTop=7500\n"
                           "Width=2500\nHeight=2500\n");
  TIDEDesktopService::BeginUpdate();
  LoadDesktopFormClasses(Desktop.Get());
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(Wide->BoundsRect(), Rect(2880, 1590, 3840, 2120));

  // A work area below a task bar: ordinary and tool windows are saved and loaded alike.
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 40, 1920, 1080), 96, true}});
  auto* Tool = MakeWindow<TPaneWindow>("Tool");
  Register(TPaneWindow::StaticClass(), "Tool");
  Tool->SetBorderStyle(bsToolWindow);
  for (TDesktopForm* F : {static_cast<TDesktopForm*>(Wide), static_cast<TDesktopForm*>(Tool)}) {
    F->SetBounds(100, 140, 400, 300);
    F->Show();
  }
  EXPECT_EQ(Wide->Placement().rcNormalPosition, Rect(100, 100, 500, 400)) << "workspace coordinates";
  EXPECT_EQ(Tool->Placement().rcNormalPosition, Rect(100, 140, 500, 440)) << "screen coordinates";
  TObjectGuard<TMemIniFile> Saved(new TMemIniFile);
  SaveDesktopFormClasses(Saved.Get(), false);
  for (const char* S : {"Wide", "Tool"}) {
    EXPECT_EQ(Saved->ReadInteger(S, "Left", 0), 521) << S;
    EXPECT_EQ(Saved->ReadInteger(S, "Top", 0), 962) << S;
  }
  Wide->SetBounds(0, 0, 10, 10);
  Tool->SetBounds(0, 0, 10, 10);
  TIDEDesktopService::BeginUpdate();
  LoadDesktopFormClasses(Saved.Get());
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(Wide->BoundsRect(), Rect(100, 140, 500, 440));
  EXPECT_EQ(Tool->BoundsRect(), Rect(100, 140, 500, 440));

  // Saved across two monitors, loaded with the second one gone.
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true},
                         {Rect(1920, 0, 3200, 1024), Rect(1920, 0, 3200, 984), 96, false}});
  Wide->SetBounds(2200, 100, 800, 600);
  Tool->SetBorderStyle(bsSizeable);
  Tool->SetBounds(1500, 100, 800, 600);
  Saved->Clear();
  SaveDesktopFormClasses(Saved.Get(), false);
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true}});
  // Hidden windows take their placement when the batch ends; showing ones at once.
  for (bool Showing : {false, true}) {
    if (!Showing) {
      Wide->Hide();
      Tool->Hide();
    }
    TIDEDesktopService::BeginUpdate();
    LoadDesktopFormClasses(Saved.Get());
    if (!Showing) {
      EXPECT_EQ(Wide->BoundsRect(), Rect(1920, 100, 2720, 700)) << "clipped to the virtual desktop's edge";
    }
    TIDEDesktopService::EndUpdate();
    EXPECT_EQ(Wide->BoundsRect(), Rect(0, 0, 800, 600)) << "off every monitor: to the origin, with its size";
    EXPECT_EQ(Tool->BoundsRect(), Rect(1500, 100, 1920, 700)) << "half off: clipped to its monitor";
  }
}

TEST_F(DesktopEdges, ResolutionAndMaximisedBounds) {
  Register(TPaneWindow::StaticClass(), "Dpi");
  auto* Dpi = MakeWindow<TPaneWindow>("Dpi");
  Dpi->SetAllowAdjustPosForDPI(true);
  Dpi->ScaleForPPI(144);
  auto LoadAt = [&](const String& FilePPI) {
    auto D = DesktopOf("[Dpi]\nPercentageSizes=1\nCreate=1\nVisible=1\nLeft=1000\nTop=1000\nWidth=2500\n"
                       "Height=2500\nPixelsPerInch=" + FilePPI + "\nMonitorNum=3\n");
    TIDEDesktopService::BeginUpdate();
    LoadDesktopFormClasses(D.Get());
    TIDEDesktopService::EndUpdate();
    return Dpi->BoundsRect();
  };
  EXPECT_EQ(LoadAt("96"), Rect(192, 104, 912, 494)) << "grown by half, the corner kept";
  EXPECT_EQ(LoadAt("72"), Rect(192, 104, 672, 364)) << "a resolution below 96 is ignored";
  EXPECT_EQ(LoadAt("junk"), Rect(192, 104, 672, 364));
  Dpi->SetAllowAdjustPosForDPI(false);
  EXPECT_EQ(LoadAt("96"), Rect(192, 104, 672, 364)) << "only a window that asks for it";

  // A maximised window takes no bounds from the file, unless forced.
  Register(TPaneWindow::StaticClass(), "Max");
  auto* Max = MakeWindow<TPaneWindow>("Max");
  auto MaxDesktop = DesktopOf("[Max]\nPercentageSizes=1\nCreate=1\nVisible=1\nState=2\nLeft=1000\nTop=1000\n"
                              "Width=2500\nHeight=2500\n");
  for (bool Force : {false, true}) {
    TDesktopForm::SetForceUpdateBounds(Force);
    Max->SetWindowState(wsNormal);
    Max->Hide();
    Max->SetBounds(10, 10, 320, 240);
    TIDEDesktopService::BeginUpdate();
    LoadDesktopFormClasses(MaxDesktop.Get());
    EXPECT_EQ(Max->BoundsRect(), Force ? Rect(192, 104, 672, 364) : Rect(10, 10, 330, 250)) << Force;
    TIDEDesktopService::EndUpdate();
    EXPECT_EQ(Max->WindowState(), wsMaximized);
    EXPECT_EQ(Max->RestoredBounds(), Rect(192, 104, 672, 364));
    EXPECT_EQ(Max->BoundsRect(), Rect(0, 0, 1920, 1040));
  }
}

TEST_F(DesktopEdges, BatchingSwitchedOffEndedEarlyAndTheMainWindow) {
  Register(TPaneWindow::StaticClass(), "Max");
  auto* Max = MakeWindow<TPaneWindow>("Max");
  auto Desktop = DesktopOf("[Max]\nPercentageSizes=1\nCreate=1\nVisible=1\nState=2\nWidth=2500\nHeight=2500\n"
                           "[Main]\nLeft=50\nTop=60\nWidth=700\nHeight=500\n");
  DesktopCommandLine = {"project.prj", "/ud"};
  TIDEDesktopService::BeginUpdate();
  EXPECT_FALSE(TIDEDesktopService::IsLocked());
  LoadDesktopFormClasses(Desktop.Get());
  EXPECT_FALSE(Max->Locked());
  EXPECT_EQ(Max->WindowState(), wsMaximized) << "the placement applies at once";
  EXPECT_FALSE(Max->WindowPlacementDirty());
  EXPECT_TRUE(TIDEDesktopService::LockedForms().empty());
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(TIDEDesktopService::UpdateCount(), 0);
  DesktopCommandLine.clear();

  // An end without a begin stays at 0 and still ends the batch.
  Max->LockUpdates();
  EXPECT_TRUE(Max->Locked());
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(TIDEDesktopService::UpdateCount(), 0);
  EXPECT_FALSE(Max->Locked());
  EXPECT_TRUE(TIDEDesktopService::LockedForms().empty());

  // Nested batches end once.
  TIDEDesktopService::BeginUpdate();
  TIDEDesktopService::BeginUpdate();
  auto* Late = MakeWindow<TPaneWindow>("Late");
  EXPECT_TRUE(Late->Locked()) << "a window made in the batch joins it from the first";
  TIDEDesktopService::EndUpdate();
  EXPECT_TRUE(Late->Locked());
  TIDEDesktopService::EndUpdate();
  EXPECT_FALSE(Late->Locked());

  // The main window loads without "Create", visible, in pixels without "PercentageSizes".
  auto* Main = MakeWindow<TPaneWindow>("Main");
  Main->SetPosition(poScreenCenter);
  auto* Other = MakeWindow<TPaneWindow>("Main2");
  Other->SetDeskSection("Main");
  Application()->SetMainForm(Main);
  Main->LoadWindowState(Desktop.Get());
  Other->LoadWindowState(Desktop.Get());
  EXPECT_EQ(Main->BoundsRect(), Rect(50, 60, 750, 560));
  EXPECT_TRUE(Main->Visible());
  EXPECT_TRUE(Main->LoadedFromDesktop());
  EXPECT_EQ(Main->Position(), poDesigned) << "placed where the desktop says";
  EXPECT_FALSE(Other->LoadedFromDesktop()) << "any other window needs \"Create\"";
  EXPECT_FALSE(Other->Visible());
  Main->LoadWindowState(nullptr);
}

TEST_F(DesktopEdges, BadDesktopsLoadWhatTheyCanAndNothingLeavesTheMonitors) {
  for (const char* S : {"Huge", "Broken", "Negative", "Garbage", "Missing", "BadHost"})
    Register(String(S) == "Broken" ? TBrokenWindow::StaticClass()
                                   : (String(S) == "BadHost" ? THostWindow::StaticClass() : TPaneWindow::StaticClass()),
             S);
  auto Desktop = DesktopOf("[Huge]\nPercentageSizes=1\nCreate=1\nVisible=1\nLeft=99999999\nTop=-99999999\n"
                           "Width=2000000000\nHeight=abc\nState=7\n"
                           "[Broken]\nCreate=1\nVisible=1\n"
                           "[Negative]\nPercentageSizes=1\nCreate=1\nVisible=1\nLeft=-500\nTop=-500\nWidth=-20\n"
                           "Height=0\n"
                           "[Garbage]\nCreate=yes\nVisible=maybe\n"
                           "[Ghost]\nCreate=1\nVisible=1\n"
                           "[BadHost]\nCreate=1\nVisible=1\nDockClients=Ghost\nDockSiteData=ZZ\n");
  TIDEDesktopService::BeginUpdate();
  LoadDesktopFormClasses(Desktop.Get());
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(Application()->ShownExceptions(),
            (std::vector<String>{"bad section", "'ZZ' is not valid hexadecimal text"}));
  ASSERT_NE(Vars["Huge"], nullptr);
  ASSERT_NE(Vars["Negative"], nullptr);
  EXPECT_EQ(Vars["Garbage"], nullptr) << "a bad Boolean reads as its default";
  EXPECT_EQ(Vars["Missing"], nullptr);
  EXPECT_EQ(Vars["Huge"]->WindowState(), wsNormal);
  EXPECT_EQ(Vars["Huge"]->Height(), 240) << "a bad height keeps the current one";
  ExpectOnAMonitor(Vars["Huge"], "Huge");
  ExpectOnAMonitor(Vars["BadHost"], "BadHost");
  EXPECT_EQ(Vars["Negative"]->BoundsRect(), Rect(0, 0, 320, 240)) << "clipped, sizes from the window";
  EXPECT_NE(Vars["Broken"], nullptr);
  ExpectOnAMonitor(Vars["Negative"], "Negative");
}

} // namespace
