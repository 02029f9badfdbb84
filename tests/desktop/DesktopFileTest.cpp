//===- tests/desktop/DesktopFileTest.cpp - Saving and loading desktops ---===//
#include "tests/desktop/DesktopTestWindows.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

const char* const SavedDesktop =
    "[Floating]\nPercentageSizes=1\nCreate=1\nVisible=1\nDocked=0\nState=0\nLeft=1000\nTop=1000\n"
    "Width=5000\nHeight=5000\nMaxLeft=-5\nMaxTop=-10\nClientWidth=4917\nClientHeight=4625\n\n"
    "[Maxed]\nPercentageSizes=1\nCreate=1\nVisible=1\nDocked=0\nState=2\nLeft=0\nTop=0\n"
    "Width=4167\nHeight=5769\nMaxLeft=-5\nMaxTop=-10\nMaxWidth=4167\nMaxHeight=5769\n"
    "ClientWidth=9917\nClientHeight=9625\n\n"
    "[Minimised]\nPercentageSizes=1\nCreate=1\nVisible=1\nDocked=0\nState=1\nLeft=5000\nTop=5000\n"
    "Width=2500\nHeight=2500\nMaxLeft=-5\nMaxTop=-10\nClientWidth=2417\nClientHeight=2125\n\n"
    "[Docked]\nPercentageSizes=1\nCreate=1\nVisible=1\nDocked=1\nState=0\nLeft=0\nTop=0\n"
    "Width=1615\nHeight=1923\nMaxLeft=-1\nMaxTop=-1\nClientWidth=1531\nClientHeight=1548\n\n"
    "[Host]\nPercentageSizes=1\nCreate=1\nVisible=1\nDocked=0\nState=0\nLeft=6000\nTop=1000\n"
    "Width=3000\nHeight=8000\nMaxLeft=-5\nMaxTop=-10\nClientWidth=2917\nClientHeight=7625\n"
    "DockClients=Docked\nDockSiteData=446F636B6564\n\n";

class DesktopFile : public DesktopTest {
protected:
  /// Floating, maximised, minimised, docked and host windows on the default monitor.
  void MakeDesktop() {
    for (const char* S : {"Floating", "Maxed", "Minimised", "Docked"}) Register(TPaneWindow::StaticClass(), S);
    Register(THostWindow::StaticClass(), "Host");
    Register(TPaneWindow::StaticClass(), "NeverMade");
    auto* Floating = MakeWindow<TPaneWindow>("Floating");
    Floating->SetBounds(192, 104, 960, 520);
    Floating->Show();
    auto* Maxed = MakeWindow<TPaneWindow>("Maxed");
    Maxed->SetBounds(0, 0, 800, 600);
    Maxed->Show();
    Maxed->SetWindowState(wsMaximized);
    auto* Minimised = MakeWindow<TPaneWindow>("Minimised");
    Minimised->SetBounds(960, 520, 480, 260);
    Minimised->Show();
    Minimised->SetWindowState(wsMinimized);
    auto* Host = MakeWindow<THostWindow>("Host");
    Host->SetBounds(1152, 104, 576, 832);
    Host->Show();
    auto* Docked = MakeWindow<TPaneWindow>("Docked");
    Docked->SetBounds(0, 0, 310, 200);
    ManualDock(Docked, Host);
    Docked->Show();
    // Not saved: it asks not to be.
    auto* Scratch = MakeWindow<TPaneWindow>("Scratch");
    Register(TPaneWindow::StaticClass(), "Scratch");
    Scratch->SetAutoSave(false);
  }

  void FreeWindows() {
    for (auto& Entry : Vars)
      if (TCustomForm* F = Entry.second; F && Exists(F)) F->Destroy();
    for (auto& Entry : Vars) Entry.second = nullptr;
    Loaded->Clear();
  }
};

TEST_F(DesktopFile, SavedWithExactKeysAndRelativeUnits) {
  MakeDesktop();
  String Name = Temp.File("layout.dsk");
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(Name));
  SaveDesktopFormClasses(Desktop.Get(), false);
  DoDesktopSaveProcs(Desktop.Get(), false);
  Desktop->UpdateFile();
  EXPECT_EQ(Slurp(Name), SavedDesktop);

  // A window that saves its resolution adds its monitor's number and its pixels per inch.
  auto* Floating = static_cast<TDesktopForm*>(Vars["Floating"]);
  Floating->SetAllowAdjustPosForDPI(true);
  Floating->SaveWindowState(Desktop.Get(), false);
  EXPECT_EQ(Desktop->ReadString("Floating", "PixelsPerInch", ""), "96");
  EXPECT_EQ(Desktop->ReadString("Floating", "MonitorNum", ""), "0");
  Floating->SaveWindowState(nullptr, false); // nothing to write into
}

TEST_F(DesktopFile, LoadedOnOtherMonitorsAtTheScaledRectangles) {
  MakeDesktop();
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile);
  SaveDesktopFormClasses(Desktop.Get(), false);
  FreeWindows();
  // Another resolution, another primary to the right of a smaller monitor.
  Screen()->SetMonitors({{Rect(-1280, 0, 0, 1024), Rect(-1280, 0, 0, 984), 96, false},
                         {Rect(0, 0, 2560, 1440), Rect(0, 0, 2560, 1400), 96, true}});
  TIDEDesktopService::BeginUpdate();
  LoadDesktopFormClasses(Desktop.Get());
  auto* Maxed = static_cast<TDesktopForm*>(Vars["Maxed"]);
  ASSERT_NE(Maxed, nullptr) << "the registry makes the windows the desktop names";
  // In the batch: the placement waits, drawing is frozen.
  EXPECT_TRUE(Maxed->Locked());
  EXPECT_TRUE(Maxed->WindowPlacementDirty());
  EXPECT_EQ(Maxed->WindowState(), wsNormal);
  EXPECT_EQ(Maxed->WindowPlacement().showCmd, SW_SHOWMAXIMIZED);
  EXPECT_EQ(Maxed->DrawingLockCount(), 1);
  EXPECT_EQ(TIDEDesktopService::LockedForms().size(), 5u);
  TIDEDesktopService::EndUpdate();
  EXPECT_TRUE(TIDEDesktopService::LockedForms().empty());

  EXPECT_EQ(Vars["Floating"]->BoundsRect(), Rect(256, 140, 1536, 840));
  EXPECT_EQ(Maxed->WindowState(), wsMaximized);
  EXPECT_EQ(Maxed->BoundsRect(), Rect(0, 0, 2560, 1400));
  EXPECT_EQ(Maxed->RestoredBounds(), Rect(0, 0, 1067, 808));
  EXPECT_FALSE(Maxed->Locked());
  EXPECT_EQ(Vars["Minimised"]->WindowState(), wsMinimized);
  EXPECT_EQ(Vars["Minimised"]->RestoredBounds(), Rect(1280, 700, 1920, 1050));
  auto* Host = static_cast<THostWindow*>(Vars["Host"]);
  EXPECT_EQ(Host->BoundsRect(), Rect(1536, 140, 2304, 1260));
  EXPECT_EQ(HostDockSite(Vars["Docked"]), Host) << "the host docks its client again";
  EXPECT_TRUE(Vars["Docked"]->Visible());
  EXPECT_EQ(Host->Manager->Loaded, "Docked") << "and restores its arrangement";
  for (const char* S : {"Floating", "Maxed", "Minimised", "Host"}) {
    auto* F = static_cast<TDesktopForm*>(Vars[S]);
    EXPECT_TRUE(F->Visible()) << S;
    EXPECT_TRUE(F->LoadedFromDesktop()) << S;
    EXPECT_FALSE(F->WindowPlacementDirty()) << S;
    ExpectOnAMonitor(F, S);
  }
  EXPECT_EQ(Vars["NeverMade"], nullptr) << "a section the desktop lacks makes no window";
  EXPECT_EQ(Loaded->CommaText(), "Floating,Maxed,Minimised,Docked,Host");

  // Drawing comes back through the posted message.
  EXPECT_TRUE(Host->UnlockMessagePosted());
  ProcessMessages();
  EXPECT_FALSE(Host->UnlockMessagePosted());
  EXPECT_EQ(Host->DrawingLockCount(), 0);
}

TEST_F(DesktopFile, DesktopsThatCannotBeReadOrWrittenChangeNothing) {
  MakeDesktop();
  String Name = Temp.File("layout.dsk");
  {
    TObjectGuard<TMemIniFile> First(new TMemIniFile(Name));
    SaveDesktopFormClasses(First.Get(), false);
    First->UpdateFile();
  }
  // The save of a moved window to a place that cannot be written: the old file stays.
  Vars["Floating"]->SetBounds(0, 0, 100, 100);
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(Name));
  SaveDesktopFormClasses(Desktop.Get(), false);
  Desktop->Rename(Temp.File("missing/layout.dsk"), false);
  EXPECT_THROW(Desktop->UpdateFile(), EFCreateError);
  EXPECT_EQ(Slurp(Name), SavedDesktop);
  EXPECT_EQ(Vars["Floating"]->BoundsRect(), Rect(0, 0, 100, 100));

  // A desktop that cannot be read fails before any window is touched.
  std::map<String, TCustomForm*> Before = Vars;
  TIDEDesktopService::BeginUpdate();
  EXPECT_THROW(TMemIniFile Unreadable(Temp.Path()), EFOpenError);
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(Vars, Before);
  EXPECT_EQ(Vars["Floating"]->BoundsRect(), Rect(0, 0, 100, 100));
  EXPECT_EQ(Vars["Maxed"]->WindowState(), wsMaximized);
  EXPECT_EQ(Loaded->Count(), 0);

  // The file as written loads back to the same windows.
  FreeWindows();
  TObjectGuard<TMemIniFile> Again(new TMemIniFile(Name));
  TIDEDesktopService::BeginUpdate();
  LoadDesktopFormClasses(Again.Get());
  TIDEDesktopService::EndUpdate();
  EXPECT_EQ(Vars["Floating"]->BoundsRect(), Rect(192, 104, 1152, 624));
  EXPECT_EQ(Vars["Maxed"]->RestoredBounds(), Rect(0, 0, 800, 600));
  EXPECT_EQ(Vars["Minimised"]->RestoredBounds(), Rect(960, 520, 1440, 780));
  EXPECT_EQ(Vars["Host"]->BoundsRect(), Rect(1152, 104, 1728, 936));
  TObjectGuard<TMemIniFile> Resaved(new TMemIniFile);
  SaveDesktopFormClasses(Resaved.Get(), false);
  // The same file, but for the docked window: its host gives it its size (here its first
  // one, 320 by 240), not the file.
  String Expected = SavedDesktop;
  String DockedSizes = "Width=1615\nHeight=1923\nMaxLeft=-1\nMaxTop=-1\nClientWidth=1531\nClientHeight=1548";
  Expected.replace(Expected.find(DockedSizes), DockedSizes.size(),
                   "Width=1667\nHeight=2308\nMaxLeft=-1\nMaxTop=-1\nClientWidth=1583\nClientHeight=1933");
  EXPECT_EQ(Resaved->Text(), Expected);
}

} // namespace
