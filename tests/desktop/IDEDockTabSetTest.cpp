//===- tests/desktop/IDEDockTabSetTest.cpp - The strip of pinned windows -===//
#include "desktop/DockForm.h"
#include "desktop/IDEDockTabSet.h"
#include "tests/desktop/DesktopTestSupport.h"

namespace formkit::desktoptest {
namespace {

class TPinnedWindow : public TDesktopForm {
  FK_CLASS(TPinnedWindow, TDesktopForm)
public:
  bool ShouldAutoHide() override { return AutoHide; }
  bool AutoHide = true;
};

class TTabHostWindow : public TDesktopForm, public TDockHostLink {
  FK_CLASS(TTabHostWindow, TDesktopForm)
public:
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    SetDockSite(this, true);
  }
  TIDEDockType HostDockType() const override { return dtTab; }
  void ManualDockClient(TControl* Client, TControl*, TAlign, bool) override { ManualDock(Client, this); }
  void ResetStayOnTop() override {}
};

FK_IMPLEMENT(TPinnedWindow, "IDEDockTabSetTest") {}
FK_IMPLEMENT(TTabHostWindow, "IDEDockTabSetTest") {}

class DockTabs : public DesktopTest {
protected:
  TDesktopForm* Editor = nullptr;
  TIDEDockTabSet* Strip = nullptr;

  void SetUp() override {
    DesktopTest::SetUp();
    Editor = CreateComponentOf<TDesktopForm>(Application());
    Editor->SetDeskSection("EditWindow");
    Strip = CreateComponentOf<TIDEDockTabSet>(Editor);
    Strip->SetParent(Editor);
    Strip->SetAlign(alBottom);
  }

  TPinnedWindow* Window(const String& Section) {
    auto* W = CreateComponentOf<TPinnedWindow>(Application());
    W->SetName(Section);
    W->SetCaption(Section + " window");
    W->SetDeskSection(Section);
    W->Show();
    return W;
  }
};

TEST_F(DockTabs, SavedAsSectionsAndTabsAndLoadedWithoutGaps) {
  TPinnedWindow* A = Window("a");
  TPinnedWindow* B = Window("b");
  auto Empty = DesktopOf("");
  Strip->SaveState(Empty.Get(), false, "BottomTabs", Editor);
  EXPECT_EQ(Empty->ReadString("EditWindow", "BottomTabs", "none"), "none") << "nothing for an empty strip";
  ManualDock(A, Strip);
  ManualDock(B, Strip);
  EXPECT_FALSE(A->Visible()) << "pinned away";
  EXPECT_EQ(Strip->Tabs(0), "a window");
  EXPECT_EQ(Strip->Tabs(1), "b window");
  auto Saved = DesktopOf("");
  Strip->SaveState(Saved.Get(), false, "BottomTabs", Editor);
  EXPECT_EQ(Saved->ReadString("EditWindow", "BottomTabs", ""), "a=0,b=1");

  // `a` does not come back: `b` stands at tab 0; what was on the strip floats.
  TPinnedWindow* Old = Window("old");
  ManualFloat(A, Rect(0, 0, 100, 100));
  ManualFloat(B, Rect(0, 0, 100, 100));
  ManualDock(Old, Strip);
  Loaded->AddObject("b", B);
  auto Desktop = DesktopOf("[EditWindow]\nBottomTabs=a=0,b=1,ghost=x\n[b]\nCreate=1\nVisible=1\nDocked=1\n");
  Strip->LoadState(Desktop.Get(), "BottomTabs", Editor);
  EXPECT_EQ(HostDockSite(Old), nullptr);
  EXPECT_EQ(DockClients(Strip), (std::vector<TControl*>{B}));
  EXPECT_EQ(Strip->TabCount(), 1);
  EXPECT_EQ(Strip->GetClientInfo(B)->TabIndex, 0);
  EXPECT_FALSE(B->Visible());
  EXPECT_FALSE(Strip->UpdatesDisabled());

  // A desktop without the section leaves the strip alone.
  auto Other = DesktopOf("[Other]\nX=1\n");
  Strip->LoadState(Other.Get(), "BottomTabs", Editor);
  EXPECT_EQ(DockClients(Strip), (std::vector<TControl*>{B}));
}

TEST_F(DockTabs, DeadTabsCloseUpAndBadValuesKeepTheTab) {
  TPinnedWindow* A = Window("a");
  TPinnedWindow* B = Window("b");
  TPinnedWindow* C = Window("c");
  ManualDock(A, Strip);
  ManualDock(B, Strip);
  ManualDock(C, Strip);
  Strip->SetTabIndex(Strip->GetClientInfo(B), 5);
  Strip->SetTabIndex(Strip->GetClientInfo(C), 7);
  EXPECT_EQ(Strip->TabCount(), 8);
  EXPECT_EQ(Strip->Tabs(1), "");
  Strip->RemoveDeadTabs();
  EXPECT_EQ(Strip->TabCount(), 3);
  EXPECT_EQ(Strip->GetClientInfo(B)->TabIndex, 1);
  EXPECT_EQ(Strip->GetClientInfo(C)->TabIndex, 2);
  EXPECT_EQ(Strip->TabClient(1), B);

  ManualFloat(A, Rect(0, 0, 10, 10));
  ManualFloat(B, Rect(0, 0, 10, 10));
  ManualFloat(C, Rect(0, 0, 10, 10));
  Loaded->AddObject("c", C);
  Loaded->AddObject("b", B);
  auto Desktop = DesktopOf("[EditWindow]\nBottomTabs=c=zz,b=0\n");
  Strip->LoadState(Desktop.Get(), "BottomTabs", Editor);
  EXPECT_EQ(Strip->GetClientInfo(B)->TabIndex, 0);
  EXPECT_EQ(Strip->GetClientInfo(C)->TabIndex, 1) << "a bad value leaves the tab it got";
  try {
    Strip->TabClient(2);
    ADD_FAILURE();
  } catch (const EListError& E) {
    EXPECT_STREQ(E.what(), "Tab index out of bounds (2)");
  }
}

TEST_F(DockTabs, NamesAutoHideAndShowing) {
  auto* Host = CreateComponentOf<TTabHostWindow>(Application());
  TPinnedWindow* One = Window("One");
  TPinnedWindow* Two = Window("Two");
  ManualDock(One, Host);
  ManualDock(Two, Host);
  EXPECT_EQ(Strip->GetTabName(Host), "One window, Two window");
  One->Hide();
  Two->Hide();
  EXPECT_EQ(Strip->GetTabName(Host), "Untitled");
  auto* Plain = CreateComponentOf<TPanel>(Editor);
  EXPECT_TRUE(Strip->ShouldAutoHide(Plain));

  TPinnedWindow* Stays = Window("Stays");
  Stays->AutoHide = false;
  ManualDock(Stays, Strip);
  EXPECT_TRUE(Stays->Visible());
  TPinnedWindow* P = Window("P");
  ManualDock(P, Strip);
  EXPECT_FALSE(P->Visible());
  TIDEDesktopService::BeginUpdate();
  Strip->SelectTab(1);
  EXPECT_FALSE(P->Visible()) << "not while the desktop batches";
  TIDEDesktopService::EndUpdate();
  Strip->SelectTab(1);
  EXPECT_TRUE(P->Visible());
  EXPECT_EQ(Strip->ShownClient(), P);
}

} // namespace
} // namespace formkit::desktoptest
