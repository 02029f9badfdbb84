//===- tests/desktop/DesignWindowsTest.cpp - Positions of editor windows -===//
#include "tests/desktop/DesktopTestWindows.h"

#include "desktop/DesignWindows.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

using EditorPositions = DesktopTest;

TEST_F(EditorPositions, OwnedWindowsMoveWithTheirOwner) {
  auto* Owner = MakeWindow<TPaneWindow>("Owner");
  Owner->SetBounds(100, 100, 800, 600);
  auto* Editor = CreateComponentOf<TForm>(Owner);
  Editor->SetBounds(5, 5, 300, 200);
  TObjectGuard<TMemIniFile> Settings(new TMemIniFile);
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(358, 331, 300, 200)) << "no saved size: centred on the owner";

  Editor->SetBounds(400, 300, 320, 240);
  Settings->WriteInteger("Editor", "MonitorIndex", 4);
  SaveFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Settings->Text(), "[Editor]\nLeft=292\nTop=169\nWidth=320\nHeight=240\n\n")
      << "relative to the owner's client area, with no monitor";
  Owner->SetLeft(500);
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(800, 300, 320, 240));
  Owner->SetLeft(1800);
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(1600, 300, 320, 240)) << "kept inside the owner's monitor";
}

TEST_F(EditorPositions, FreeWindowsKeepTheirMonitorAndScale) {
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true},
                         {Rect(1920, 0, 5760, 2160), Rect(1920, 0, 5760, 2120), 96, false}});
  auto* Editor = MakeWindow<TPaneWindow>("Editor");
  Editor->SetBounds(5000, 1500, 600, 400);
  TObjectGuard<TMemIniFile> Settings(new TMemIniFile);
  SaveFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Settings->Text(), "[Editor]\nLeft=3080\nTop=1500\nWidth=600\nHeight=400\nMonitorIndex=1\n\n");
  Editor->SetBounds(0, 0, 100, 100);
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(5000, 1500, 600, 400)) << "back on its monitor";

  // The second monitor is gone: the nearest one, clipped into it.
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true}});
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(1320, 680, 600, 400));

  // Stored at the default resolution, shown at the window's.
  Settings->SetText("[Editor]\nLeft=10\nTop=20\nWidth=300\nHeight=200\nMonitorIndex=0\n");
  Editor->ScaleForPPI(192);
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(20, 40, 600, 400));
  SaveFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Settings->Text(), "[Editor]\nLeft=10\nTop=20\nWidth=300\nHeight=200\nMonitorIndex=0\n\n");

  // Without a stored size of at least 2 by 2 a free window stays where it is.
  Settings->SetText("[Editor]\nLeft=10\nTop=20\nWidth=0\nHeight=200\n");
  LoadFormPos(Settings.Get(), "Editor", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(20, 40, 600, 400));
  LoadFormPos(Settings.Get(), "Nothing", Editor);
  EXPECT_EQ(Editor->BoundsRect(), Bounds(20, 40, 600, 400));
}

} // namespace
