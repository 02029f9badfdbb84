//===- tests/desktop/EditorDockPanelTest.cpp - Panels and the dock tree --===//
#include "desktop/DockForm.h"
#include "desktop/IDEDockPanel.h"
#include "desktop/PercentageDockTree.h"
#include "tests/desktop/DesktopTestSupport.h"

namespace formkit::desktoptest {
namespace {

class TPanelTool : public TDockableForm {
  FK_CLASS(TPanelTool, TDockableForm)
};
class TEditWindow : public TDockableForm {
  FK_CLASS(TEditWindow, TDockableForm)
};
FK_IMPLEMENT(TPanelTool, "EditorDockPanelTest") {}
FK_IMPLEMENT(TEditWindow, "EditorDockPanelTest") {}

/// Counts what a panel fires.
struct TPanelSink : TObject {
  int Removed = 0;
  int SplitterUps = 0;
  TObject* SplitterSender = nullptr;
  void DockClientRemoved(TObject*) { ++Removed; }
  void SplitterMouseUp(TObject* Sender) {
    ++SplitterUps;
    SplitterSender = Sender;
  }
};

class EditorPanels : public DesktopTest {
protected:
  TPanelSink Sink;
  TDesktopForm* Editor = nullptr;
  TEditorDockPanel* Panel = nullptr;
  TSplitter* Split = nullptr;

  void SetUp() override {
    DesktopTest::SetUp();
    Editor = CreateComponentOf<TDesktopForm>(Application());
    Editor->SetDeskSection("EditWindow");
    Editor->SetBorderStyle(bsNone);
    Editor->SetBounds(0, 0, 1600, 900);
    Panel = CreateComponentOf<TEditorDockPanel>(Editor);
    Panel->SetParent(Editor);
    Panel->SetAlign(alLeft);
    Panel->SetWidth(600);
    Split = CreateComponentOf<TSplitter>(Editor);
    Split->SetParent(Editor);
    Split->SetLeft(700);
    Panel->SetSplitter(Split);
    Panel->OnDockClientRemoved = TNotifyEvent::Bind<&TPanelSink::DockClientRemoved>(&Sink);
    Panel->OnSplitterMouseUp = TNotifyEvent::Bind<&TPanelSink::SplitterMouseUp>(&Sink);
    Editor->Show();
  }

  TPercentageDockTree* Tree() const { return dynamic_cast<TPercentageDockTree*>(DockManager(Panel).Get()); }

  template <class T = TPanelTool> T* Tool(const String& Name) {
    auto* W = CreateComponentOf<T>(Application());
    W->SetName(Name);
    W->SetDeskSection(Name);
    W->SetCaption(Name);
    W->SetBorderStyle(bsNone);
    W->SetBounds(1000, 100, 250, 300);
    W->Show();
    return W;
  }
};

TEST_F(EditorPanels, SplitterAndNextControlMustStandInOrder) {
  auto Expect = [](const std::function<void()>& F, const char* Text) {
    try {
      F();
      ADD_FAILURE() << "no exception for " << Text;
    } catch (const Exception& E) {
      EXPECT_STREQ(E.what(), Text);
    }
  };
  EXPECT_EQ(Panel->Splitter(), Split);
  Editor->DisableAlign();
  auto* Other = CreateComponentOf<TEditorDockPanel>(Editor);
  Other->SetParent(Editor);
  auto* S = CreateComponentOf<TSplitter>(Editor);
  S->SetParent(Editor);
  Expect([&] { Other->SetSplitter(S); }, "Align property is not set correctly");
  Expect([&] { Other->SetNextControl(nullptr); }, "Align property is not set correctly");
  // From the edge outward: next control, panel, splitter.
  struct TCase {
    TAlign Align;
    TRect Panel, Splitter, Next;
  } Cases[] = {
      {alLeft, Bounds(100, 0, 50, 50), Bounds(90, 0, 3, 50), Bounds(160, 0, 20, 50)},
      {alRight, Bounds(100, 0, 50, 50), Bounds(160, 0, 3, 50), Bounds(90, 0, 5, 50)},
      {alTop, Bounds(0, 100, 50, 50), Bounds(0, 90, 50, 3), Bounds(0, 160, 50, 5)},
      {alBottom, Bounds(0, 100, 50, 50), Bounds(0, 160, 50, 3), Bounds(0, 90, 50, 5)},
  };
  for (const TCase& C : Cases) {
    Other->SetAlign(C.Align);
    Other->SetNextControl(nullptr);
    Other->SetBoundsRect(C.Panel);
    S->SetAlign(C.Align);
    S->SetBoundsRect(C.Splitter);
    Expect([&] { Other->SetSplitter(S); }, "Splitter control is not configured correctly");
    S->SetAlign(C.Align == alLeft ? alTop : alLeft);
    S->SetBoundsRect(C.Next);
    Expect([&] { Other->SetSplitter(S); }, "Splitter control is not configured correctly");
    S->SetAlign(C.Align);
    S->SetBoundsRect(C.Next);
    Expect([&] { Other->SetNextControl(S); }, "NextControl is not configured correctly");
    EXPECT_EQ(Other->NextControl(), nullptr) << "a refusal changes nothing";
    S->SetBoundsRect(C.Splitter);
    Other->SetNextControl(S);
    EXPECT_EQ(Other->NextControl(), S);
    S->SetBoundsRect(C.Next);
    Other->SetSplitter(S);
    EXPECT_EQ(Other->Splitter(), S);
  }
  S->Destroy();
  EXPECT_EQ(Other->Splitter(), nullptr) << "a splitter that goes is forgotten";
  EXPECT_EQ(Other->NextControl(), nullptr);
  Editor->EnableAlign();
}

TEST_F(EditorPanels, AdjustPositionStacksNextPanelAndSplitter) {
  Editor->DisableAlign();
  auto* Next = CreateComponentOf<TEditorDockPanel>(Editor);
  Next->SetParent(Editor);
  Next->SetAlign(alLeft);
  Next->SetBounds(0, 0, 100, 900);
  Panel->SetBounds(101, 0, 600, 900);
  Split->SetBounds(702, 0, 3, 900);
  Panel->SetNextControl(Next);
  Next->SetWidth(150);
  Split->Hide();
  Panel->AdjustPosition();
  EXPECT_EQ(Panel->Left(), 151);
  EXPECT_EQ(Split->Left(), 752);
  EXPECT_TRUE(Split->Visible());
  Next->SetWidth(0);
  Panel->AdjustPosition();
  EXPECT_EQ(Panel->Left(), 151) << "a collapsed next control does not move the panel";
  Editor->EnableAlign();
}

TEST_F(EditorPanels, LastClientLeavingCollapsesAndItComesBackAtItsWidth) {
  TPanelTool* A = Tool("A");
  TPanelTool* B = Tool("B");
  ManualDock(A, Panel);
  ManualDock(B, Panel, A, alBottom);
  EXPECT_EQ(Panel->VisibleClientCount(), 2);
  // The caption strip: 12 points at 96 pixels per inch is 16 pixels, plus 8.
  EXPECT_EQ(Tree()->GetGrabberSize(), 24);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 24, 600, 446));
  EXPECT_EQ(B->BoundsRect(), Rect(0, 478, 600, 900)) << "below a splitter of 8";

  B->Hide();
  EXPECT_EQ(Panel->Width(), 600) << "one client is still visible";
  A->Hide();
  EXPECT_EQ(Panel->Width(), 0) << "no visible client: collapsed";
  EXPECT_FALSE(Split->Visible());
  A->Show();
  EXPECT_EQ(Panel->Width(), 600) << "the client's own width";
  EXPECT_TRUE(Split->Visible());
  B->Show();

  ManualFloat(B, Rect(1000, 100, 1250, 400));
  EXPECT_EQ(Sink.Removed, 1);
  EXPECT_EQ(Panel->Width(), 600) << "another visible client stays";
  EXPECT_EQ(A->BoundsRect(), Rect(0, 24, 600, 900));
  ManualFloat(A, Rect(1000, 100, 1250, 400));
  EXPECT_EQ(Sink.Removed, 2);
  EXPECT_EQ(Panel->Width(), 0) << "the only visible client left";
  EXPECT_FALSE(Split->Visible());
  EXPECT_EQ(LRDockWidth(A), 600) << "what it had in the panel";

  // Dropped back on the collapsed panel: it opens at the client's remembered width.
  {
    TDragDockObject Drop(A);
    Drop.SetDockRect(Rect(0, 0, 0, 900));
    Panel->DockDrop(&Drop, 0, 0);
  }
  EXPECT_EQ(HostDockSite(A), Panel);
  EXPECT_EQ(Panel->Width(), 600);
  EXPECT_EQ(Split->Left(), 600) << "shown, and stacked by the layout right after the panel";
  EXPECT_TRUE(Split->Visible());
  EXPECT_EQ(Tree()->BorderWidth(), 8);
  EXPECT_FALSE(TIDEDesktopService::IsDrawingLocked());

  // A suspended panel stays open.
  Panel->SetResizeSuspended(true);
  ManualFloat(A, Rect(1000, 100, 1250, 400));
  EXPECT_EQ(Panel->Width(), 600);
  Panel->SetResizeSuspended(false);
  ResetDockSite(Panel);
  EXPECT_EQ(Panel->Width(), 0);
}

TEST_F(EditorPanels, PreviewCoversAtMostHalfTheParent) {
  Panel->SetWidth(1200);
  TPanelTool* A = Tool("A");
  A->SetBounds(1300, 100, 250, 300);
  TDockDrag Drag(A);
  Drag.MoveTo(Point(1000, 400));
  EXPECT_EQ(Drag.DragObject()->DragTarget(), Panel);
  EXPECT_EQ(Drag.DragObject()->DockRect(), Rect(0, 0, 800, 900)) << "left edge kept, half of 1600 wide";
  ASSERT_TRUE(Drag.Drop());
  EXPECT_EQ(HostDockSite(A), Panel);
}

TEST_F(EditorPanels, DefaultInsertAtSteersOneVisibleDocking) {
  TPanelTool* A = Tool("A");
  TPanelTool* B = Tool("B");
  TPanelTool* C = Tool("C");
  TPanelTool* D = Tool("D");
  ManualDock(A, Panel);
  DefaultInsertAt = alTop;
  C->Hide();
  ManualDock(C, Panel, A, alRight);
  EXPECT_EQ(DefaultInsertAt, alTop) << "a hidden docking leaves it";
  ManualDock(B, Panel, A, alRight);
  EXPECT_EQ(DefaultInsertAt, alNone);
  EXPECT_EQ(B->Left(), A->Left());
  EXPECT_LT(B->Top(), A->Top()) << "above instead of to the right";
  ManualDock(D, Panel, A, alRight);
  EXPECT_GT(D->Left(), A->Left());
  EXPECT_NE(Tree()->InfoOf(D), nullptr);
  ManualFloat(D, Rect(0, 0, 10, 10));
  EXPECT_EQ(Tree()->InfoOf(D), nullptr);
}

TEST_F(EditorPanels, SplitterMovesKeepColumnsAtLeast230) {
  TPanelTool* A = Tool("A");
  TPanelTool* B = Tool("B");
  ManualDock(A, Panel);
  ManualDock(B, Panel, A, alRight);
  ASSERT_EQ(A->Width(), 296);
  auto Move = [&](int From, int To) {
    ASSERT_TRUE(Tree()->MouseDown(mbLeft, From, 400));
    EXPECT_EQ(Tree()->LastMouseDownPos(), Point(From, 400));
    bool Handled = false;
    Tree()->MouseUp(mbLeft, To, 400, Handled);
    EXPECT_FALSE(TIDEDesktopService::IsDrawingLocked());
  };
  // On a left panel the column that is sized is measured as narrowing when dragged right.
  Move(300, 370);
  EXPECT_EQ(A->Width(), 296) << "it would leave 226";
  EXPECT_EQ(Sink.SplitterUps, 1);
  EXPECT_EQ(Sink.SplitterSender, Panel);
  Move(300, 220);
  EXPECT_EQ(A->Width(), 296) << "the rest would be 224";
  EXPECT_EQ(Sink.SplitterUps, 2);
  Move(300, 230);
  EXPECT_EQ(A->Width(), 230) << "a rest of 234 is enough";
  EXPECT_EQ(Sink.SplitterUps, 2);

  // One column: no limit.
  ManualDock(B, Panel, A, alBottom);
  int Border = A->BoundsRect().Bottom + 2;
  ASSERT_TRUE(Tree()->MouseDown(mbLeft, 10, Border));
  bool Handled = false;
  Tree()->MouseUp(mbLeft, 500, Border + 300, Handled);
  EXPECT_EQ(A->BoundsRect().Bottom, Border + 300) << "moved all the way";
  EXPECT_EQ(Sink.SplitterUps, 2);
}

TEST_F(EditorPanels, CaptionsButtonsAndHotState) {
  TPanelTool* A = Tool("A");
  ManualDock(A, Panel);
  TPercentageDockTree* T = Tree();
  EXPECT_EQ(T->AdjustCaptionRect(Rect(0, 0, 300, 400)), Rect(1, 0, 298, 23));
  auto* Drawer = dynamic_cast<TPercentageCaptionDrawer*>(T->DockCaptionDrawer());
  ASSERT_NE(Drawer, nullptr);
  EXPECT_EQ(Drawer->GetCloseRect(Rect(1, 0, 298, 23), Panel), Rect(274, 2, 294, 22));
  EXPECT_EQ(Drawer->GetPinRect(Rect(1, 0, 298, 23), Panel), Rect(254, 2, 274, 22));

  TObjectGuard<TCanvas> Canvas(new TCanvas);
  T->PaintSite(Canvas.Get());
  EXPECT_EQ(T->InfoOf(A)->FCaptionRect, Rect(1, 0, 598, 23));
  int Before = InvalidationCount(Panel);
  T->MouseMove(580, 10);
  EXPECT_EQ(T->InfoOf(A)->FHotButton, HTCLOSE);
  EXPECT_EQ(InvalidationCount(Panel), Before + 1);
  T->MouseMove(560, 10);
  EXPECT_EQ(T->InfoOf(A)->FHotButton, HTPIN);
  T->MouseMove(100, 10);
  EXPECT_EQ(T->InfoOf(A)->FHotButton, 0) << "on the caption but on no button";
  T->MouseMove(560, 10);
  T->MouseLeave();
  EXPECT_EQ(T->InfoOf(A)->FHotButton, 0);
  EXPECT_EQ(InvalidationCount(Panel), Before + 5) << "each change of the hot button repaints";

  // Vertical captions: down the left side, buttons across it.
  TPercentageDockTree Vertical(Panel, dcoVertical);
  EXPECT_EQ(Vertical.AdjustCaptionRect(Rect(0, 0, 300, 400)), Rect(1, 0, 23, 397));
  auto* VDrawer = dynamic_cast<TPercentageCaptionDrawer*>(Vertical.DockCaptionDrawer());
  EXPECT_EQ(VDrawer->GetCloseRect(Rect(1, 0, 23, 397), Panel), Rect(5, 8, 19, 22));
  EXPECT_EQ(VDrawer->GetPinRect(Rect(1, 0, 23, 397), Panel), Rect(5, 36, 19, 50));

  // A panel that hides captions has none while it has clients.
  Panel->SetHideDockTreeCaption(true);
  EXPECT_EQ(T->GetGrabberSize(), 0);
  EXPECT_EQ(T->AdjustCaptionRect(Rect(0, 0, 300, 400)), Rect(0, 0, 300, 400));
}

TEST_F(EditorPanels, StateComesBackRelativeToThePrimaryMonitor) {
  TPanelTool* A = Tool("A");
  TPanelTool* B = Tool("B");
  Panel->SetWidth(960);
  ManualDock(A, Panel);
  ManualDock(B, Panel, A, alRight);
  auto Saved = DesktopOf("[EditWindow]\nPercentageSizes=1\n");
  Panel->SaveState(Saved.Get(), false, "LeftPanelSize", "LeftPanelClients", "LeftPanelData", Editor);
  EXPECT_EQ(Saved->ReadString("EditWindow", "LeftPanelSize", ""), "5000");
  EXPECT_EQ(Saved->ReadString("EditWindow", "LeftPanelClients", ""), "A,B");
  EXPECT_EQ(Saved->ReadString("EditWindow", "LeftPanelData", ""),
            "01000000" "01" "02" "10270000" "02000000" "00" "00" "88130000" "01000000" "41"
            "00" "00" "88130000" "01000000" "42");

  // Another monitor, the clients elsewhere: half of 1280 wide, B right of A again.
  Screen()->SetMonitors({{Rect(0, 0, 1280, 1024), Rect(0, 0, 1280, 984), 96, true}});
  ManualFloat(A, Rect(0, 0, 100, 100));
  ManualDock(B, Panel);
  ManualDock(A, Panel, B, alRight);
  Loaded->AddObject("A", A);
  Loaded->AddObject("B", B);
  Panel->LoadState(Saved.Get(), "LeftPanelSize", "LeftPanelClients", "LeftPanelData", Editor);
  EXPECT_EQ(Panel->Width(), 640);
  EXPECT_EQ(DockClients(Panel), (std::vector<TControl*>{B, A}));
  EXPECT_LT(A->Left(), B->Left());
  EXPECT_EQ(A->Width(), 316);
  EXPECT_FALSE(Panel->ResizeSuspended());

  // No section: nothing changes.
  auto Empty = DesktopOf("[Other]\nX=1\n");
  Panel->LoadState(Empty.Get(), "LeftPanelSize", "LeftPanelClients", "LeftPanelData", Editor);
  EXPECT_EQ(Panel->Width(), 640);
}

TEST_F(EditorPanels, BottomPanelsWorkByHeight) {
  auto* Bottom = CreateComponentOf<TEditorDockPanel>(Editor);
  Bottom->SetParent(Editor);
  Bottom->SetAlign(alBottom);
  Bottom->SetHeight(300);
  TPanelTool* A = Tool("A");
  ManualDock(A, Bottom);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 24, 1600, 300)) << "below the caption";
  A->Hide();
  EXPECT_EQ(Bottom->Height(), 0);
  A->Show();
  EXPECT_EQ(Bottom->Height(), 276 + 24) << "the client's height plus a horizontal caption";

  TPanelTool* B = Tool("B");
  B->SetBounds(1300, 100, 250, 300);
  TDockDrag Drag(B);
  Drag.MoveTo(Point(900, 800));
  EXPECT_EQ(Drag.DragObject()->DragTarget(), A) << "the middle of a docked form is its tab zone";
  Drag.MoveTo(Point(900, 610));
  ASSERT_EQ(Drag.DragObject()->DragTarget(), Bottom) << "on the caption strip";
  EXPECT_EQ(Drag.DragObject()->DockRect(), Rect(0, 600, 1600, 900));
  Bottom->SetHeight(700);
  Drag.MoveTo(Point(900, 205));
  ASSERT_EQ(Drag.DragObject()->DragTarget(), Bottom);
  EXPECT_EQ(Drag.DragObject()->DockRect(), Rect(0, 450, 1600, 900)) << "at most half the parent, bottom edge kept";
}

TEST_F(EditorPanels, EditorLeavingASidePanelShrinksIt) {
  auto* E = Tool<TEditWindow>("Editor1");
  TPanelTool* A = Tool("A");
  ManualDock(A, Panel);
  ManualDock(E, Panel, A, alRight);
  int Before = Panel->Width();
  ManualFloat(E, Rect(0, 0, 100, 100));
  EXPECT_EQ(Panel->Width(), Before - 296) << "the editor's width goes with it";
}

} // namespace
} // namespace formkit::desktoptest
