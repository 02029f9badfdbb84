//===- tests/desktop/DockToolFormTest.cpp - Tool bars and the docking pump ===//
#include "desktop/DockToolForm.h"
#include "tests/desktop/DesktopTestSupport.h"

namespace formkit::desktoptest {
namespace {

class TWatchWindow : public TDockableToolbarForm {
  FK_CLASS(TWatchWindow, TDockableToolbarForm)
};
FK_IMPLEMENT(TWatchWindow, "DockToolFormTest") {}

class DockToolForms : public DesktopTest {
protected:
  TObjectGuard<TMemIniFile> Settings = DesktopOf("[Watches]\nToolbar=0\nTextLabels=1\nDockable=0\n");
  void SetUp() override {
    DesktopTest::SetUp();
    IDEIniFile = [this] { return static_cast<TCustomIniFile*>(Settings.Get()); };
    InitializeForm = [](TDesktopForm* F) { F->SetDeskSection("Watches"); };
  }
  void TearDown() override {
    IDEIniFile = nullptr;
    InitializeForm = nullptr;
    DesktopTest::TearDown();
  }
};

TEST_F(DockToolForms, ToolbarAndDockableFollowTheSettingsFile) {
  auto* W = CreateComponentOf<TWatchWindow>(Application());
  EXPECT_FALSE(W->Dockable()) << "\"Dockable\" of the section, read at creation";
  EXPECT_FALSE(IsDockSite(W));
  EXPECT_FALSE(W->ToolBar()->Visible());
  EXPECT_FALSE(W->ToolbarCmd()->Checked());
  EXPECT_TRUE(W->GetShowCaptions());
  EXPECT_TRUE(W->TextLabelsCmd()->Checked());
  EXPECT_EQ(W->ToolbarCmd()->Caption(), "&Toolbar");
  EXPECT_EQ(W->TextLabelsCmd()->Caption(), "Text &Labels");
  ASSERT_EQ(W->ToolbarPopupMenu()->Items()->Count(), 2);
  EXPECT_EQ(W->ToolbarPopupMenu()->Items()->Items(1)->Caption(), "Text &Labels");
  EXPECT_EQ(W->FormPopupMenu()->Items()->Items(0)->Caption(), "&Dockable");

  // Each command writes its key at once.
  W->ToolbarCmd()->Execute();
  EXPECT_TRUE(W->ToolBar()->Visible());
  EXPECT_EQ(Settings->ReadString("Watches", "Toolbar", ""), "1");
  EXPECT_EQ(W->ToolBar()->Height(), W->ToolBar()->ButtonHeight() + 8) << "grown for the captions";
  W->TextLabelsCmd()->Execute();
  EXPECT_FALSE(W->GetShowCaptions());
  EXPECT_EQ(W->ToolBar()->Height(), 30);
  EXPECT_EQ(Settings->ReadString("Watches", "TextLabels", ""), "0");

  // A saved window writes both; a load reads them back.
  Settings->WriteBool("Watches", "Toolbar", false);
  auto Desktop = DesktopOf("");
  W->SaveWindowState(Desktop.Get(), false);
  EXPECT_EQ(Settings->ReadString("Watches", "Toolbar", ""), "1");
  Settings->WriteBool("Watches", "TextLabels", true);
  W->LoadToolbarState();
  EXPECT_TRUE(W->GetShowCaptions());
}

/// Records the messages it receives; the first `UMFinalUndock` posts another.
struct TRecorder : TMessageTarget {
  std::vector<std::uint32_t> Seen;
  void WndProc(TMessage& M) override {
    Seen.push_back(M.Msg);
    if (M.Msg == UMFinalUndock && M.WParam == 0) PostMessage(this, UMFinalUndock, 1, 0);
  }
  ~TRecorder() { RemoveMessages(this); }
};

TEST_F(DockToolForms, PumpDeliversOnlyDockingMessagesAndStopsAtQuit) {
  TRecorder R;
  PostMessage(&R, WM_USER + 1, 0, 0);
  PostMessage(&R, UMFinalUndock, 0, 0);
  PostMessage(&R, CMDeferredDockUpdate, 0, 0);
  PumpDockingMessages();
  // Final undocks first, the one posted meanwhile too, then the deferred updates.
  EXPECT_EQ(R.Seen, (std::vector<std::uint32_t>{UMFinalUndock, UMFinalUndock, CMDeferredDockUpdate}));
  EXPECT_EQ(PendingMessageCount(&R), 1) << "other messages wait for the loop";

  R.Seen.clear();
  PostMessage(&R, WM_QUIT, 0, 0);
  PostMessage(&R, CMDeferredDockUpdate, 0, 0);
  PumpDockingMessages();
  EXPECT_TRUE(R.Seen.empty()) << "the quit message stops the pump";
  TMessageTarget* T = nullptr;
  TMessage M;
  ASSERT_TRUE(PeekMessage(T, M, WM_USER, WM_USER + 1, false));
  EXPECT_EQ(M.Msg, static_cast<std::uint32_t>(WM_USER + 1)) << "first in the queue, and left there";
  ASSERT_TRUE(PeekMessage(T, M, CMDeferredDockUpdate, CMDeferredDockUpdate, true));
  EXPECT_EQ(M.Msg, static_cast<std::uint32_t>(CMDeferredDockUpdate));
  ProcessMessages();
  EXPECT_EQ(R.Seen, (std::vector<std::uint32_t>{WM_USER + 1, WM_QUIT}));
}

} // namespace
} // namespace formkit::desktoptest
