//===- tests/desktop/DockTreeTest.cpp - Zones of a dock site and drags ---===//
#include "frameworks/kiln/KilnDockTree.h"
#include "frameworks/kiln/KilnDragDock.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "tests/desktop/DesktopTestSupport.h"

namespace formkit::desktoptest {
namespace {

class DockTree : public DesktopTest {
protected:
  TForm* Form = nullptr;
  TPanel* Site = nullptr;
  IPtr<TDockTree> Tree;

  void SetUp() override {
    DesktopTest::SetUp();
    Form = CreateComponentOf<TForm>(Application());
    Form->SetBorderStyle(bsNone);
    Form->SetBounds(100, 100, 800, 600);
    Site = Client("Site");
    Site->SetBounds(0, 0, 600, 400);
    SetDockSite(Site, true);
    Tree = New<TDockTree>(Site);
    SetDockManager(Site, Tree);
  }

  void TearDown() override {
    Tree = nullptr;
    DesktopTest::TearDown();
  }

  /// A panel of the form named `Name`.
  TPanel* Client(const String& Name) {
    auto* P = CreateComponentOf<TPanel>(Form);
    P->SetName(Name);
    P->SetParent(Form);
    P->SetBounds(0, 0, 50, 50);
    return P;
  }

  String Saved() {
    TObjectGuard<TMemoryStream> S(new TMemoryStream);
    Tree->SaveToStream(S.Get());
    std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(S->Size()));
    S->SetPosition(0);
    S->ReadBuffer(Bytes.data(), S->Size());
    return BinToHex(Bytes);
  }

  void Load(const String& Hex) {
    std::vector<std::uint8_t> Bytes = HexToBin(Hex);
    TObjectGuard<TMemoryStream> S(new TMemoryStream);
    S->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
    S->SetPosition(0);
    Tree->LoadFromStream(S.Get());
  }
};

TEST_F(DockTree, ZonesSplitKeepTheirProportionsAndGiveWay) {
  TPanel* A = Client("A");
  TPanel* B = Client("B");
  TPanel* C = Client("C");
  ManualDock(A, Site);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 600, 400)) << "the only client fills the site";
  ManualDock(B, Site, A, alRight);
  ManualDock(C, Site, B, alBottom);
  // A splitter of 4 pixels after each zone but the last.
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 298, 400));
  EXPECT_EQ(B->BoundsRect(), Rect(302, 0, 600, 198));
  EXPECT_EQ(C->BoundsRect(), Rect(302, 202, 600, 400));
  EXPECT_EQ(Tree->TopZone()->Orientation(), doVertical);
  EXPECT_EQ(Tree->FindControlZone(C)->ParentZone()->Orientation(), doHorizontal);

  // Several resizes: every edge stays within one pixel of its proportion, and the
  // original size gives the original layout back exactly.
  for (auto [W, H] : {std::pair{900, 300}, {1000, 700}, {641, 479}, {1203, 811}}) {
    Site->SetBounds(0, 0, W, H);
    double Room = W - 4;
    EXPECT_NEAR(A->Width(), Room / 2, 1.0) << W;
    EXPECT_EQ(B->Left(), A->Width() + 4);
    EXPECT_EQ(B->BoundsRect().Right, W);
    EXPECT_NEAR(B->Height(), (H - 4) / 2.0, 1.0) << H;
    EXPECT_EQ(C->Top(), B->Height() + 4);
    EXPECT_EQ(C->BoundsRect().Bottom, H);
  }
  Site->SetBounds(0, 0, 600, 400);
  EXPECT_EQ(C->BoundsRect(), Rect(302, 202, 600, 400));

  // B leaves: the zone of B and C has one child left and gives way to C, which takes
  // B's space; then A, the first zone, gives its space to the next one.
  ManualFloat(B, Rect(10, 10, 60, 60));
  EXPECT_EQ(Tree->FindControlZone(B), nullptr);
  EXPECT_EQ(Tree->FindControlZone(C)->ParentZone(), Tree->TopZone());
  EXPECT_EQ(C->BoundsRect(), Rect(302, 0, 600, 400));
  A->Destroy();
  EXPECT_EQ(C->BoundsRect(), Rect(0, 0, 600, 400));
  EXPECT_EQ(Tree->TopZone()->ChildCount(), 1);
  EXPECT_EQ(Tree->TopZone()->Orientation(), doNoOrient);
}

TEST_F(DockTree, RemovedZoneGivesItsSpaceToTheZoneBefore) {
  Site->SetWidth(608);
  TPanel* A = Client("A");
  TPanel* B = Client("B");
  TPanel* C = Client("C");
  ManualDock(A, Site);
  ManualDock(B, Site, A, alRight);
  ManualDock(C, Site, B, alRight);
  Tree->ResetChildren(Tree->TopZone());
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 200, 400));
  EXPECT_EQ(B->BoundsRect(), Rect(204, 0, 404, 400));
  EXPECT_EQ(C->BoundsRect(), Rect(408, 0, 608, 400));
  ManualFloat(B, Rect(0, 0, 10, 10));
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 403, 400)) << "two thirds of 604";
  EXPECT_EQ(C->BoundsRect(), Rect(407, 0, 608, 400));

  // A hidden client takes no space until it shows again.
  C->Hide();
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 608, 400));
  C->Show();
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 403, 400));

  // Docking above puts the new zone before the drop zone, one above the other.
  TPanel* D = Client("D");
  ManualDock(D, Site, A, alTop);
  EXPECT_EQ(D->BoundsRect(), Rect(0, 0, 403, 198));
  EXPECT_EQ(A->BoundsRect(), Rect(0, 202, 403, 400));
}

TEST_F(DockTree, SplitterDragMovesTheBorderAndTheProportionStays) {
  TPanel* A = Client("A");
  TPanel* B = Client("B");
  ManualDock(A, Site);
  ManualDock(B, Site, A, alRight);
  EXPECT_EQ(Tree->SplitterZoneAt(Point(299, 10)), Tree->FindControlZone(A));
  EXPECT_EQ(Tree->SplitterZoneAt(Point(297, 10)), nullptr);
  EXPECT_FALSE(Tree->MouseDown(mbLeft, 100, 10)) << "not on a splitter";
  EXPECT_FALSE(Tree->MouseDown(mbRight, 299, 10));
  ASSERT_TRUE(Tree->MouseDown(mbLeft, 299, 10));
  bool Handled = false;
  Tree->MouseUp(mbLeft, 400, 10, Handled);
  EXPECT_TRUE(Handled);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 400, 400));
  EXPECT_EQ(B->BoundsRect(), Rect(404, 0, 600, 400));
  EXPECT_EQ(Tree->SizingZone(), nullptr);
  Site->SetWidth(1200);
  EXPECT_NEAR(A->Width(), 1196.0 * 400 / 596, 1.0);
  // A drag past the far end stops at it.
  Site->SetWidth(600);
  ASSERT_TRUE(Tree->MouseDown(mbLeft, 401, 10));
  Tree->MouseUp(mbLeft, 5000, 10, Handled);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 596, 400));
  EXPECT_EQ(B->Width(), 0);
}

TEST_F(DockTree, SavesAndLoadsNamingClientsByName) {
  TPanel* A = Client("A");
  TPanel* B = Client("B");
  ManualDock(A, Site);
  ManualDock(B, Site, A, alRight);
  const String Layout = Saved();
  EXPECT_EQ(Layout, "01000000" "01" "02" "10270000" "02000000"
                    "00" "00" "88130000" "01000000" "41"
                    "00" "00" "88130000" "01000000" "42");
  // Another arrangement, then the saved one again: B goes back to the right of A.
  ManualDock(B, Site, A, alTop);
  EXPECT_EQ(B->BoundsRect(), Rect(0, 0, 600, 198));
  Load(Layout);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 298, 400));
  EXPECT_EQ(B->BoundsRect(), Rect(302, 0, 600, 400));

  // A client the bytes name that is gone is left out; one they do not name goes last.
  TPanel* C = Client("C");
  ManualDock(C, Site);
  B->Destroy();
  Load(Layout);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 600, 198));
  EXPECT_EQ(C->BoundsRect(), Rect(0, 202, 600, 400));

  // Bytes that are no tree change nothing.
  for (const char* Bad : {"", "02000000", "01000000" "01" "07" "10270000" "00000000",
                          "01000000" "01" "02" "10270000" "05000000" "00",
                          "01000000" "00" "00" "10270000" "01000000" "41",
                          "01000000" "01" "02" "10270000" "01000000" "00" "00" "88130000" "FFFFFFFF"}) {
    try {
      Load(Bad);
      ADD_FAILURE() << "loaded " << Bad;
    } catch (const EReadError& E) {
      EXPECT_STREQ(E.what(), "Invalid dock tree data") << Bad;
    }
    EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 600, 198)) << Bad;
    EXPECT_EQ(Tree->FindControlZone(C)->ParentZone(), Tree->TopZone());
  }
}

TEST_F(DockTree, ReplaceDockedControlTakesTheZone) {
  TPanel* A = Client("A");
  TPanel* B = Client("B");
  TPanel* X = Client("X");
  ManualDock(A, Site);
  ManualDock(B, Site, A, alRight);
  ReplaceDockedControl(A, X);
  EXPECT_EQ(X->BoundsRect(), Rect(0, 0, 298, 400));
  EXPECT_EQ(HostDockSite(A), nullptr);
  EXPECT_EQ(A->Parent(), nullptr);
  EXPECT_EQ(A->BoundsRect(), Rect(100, 100, 398, 500)) << "floating where it stood on the screen";
  EXPECT_EQ(DockClients(Site), (std::vector<TControl*>{B, X}));
  try {
    ReplaceDockedControl(A, X);
    ADD_FAILURE();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "A is not docked");
  }
  EXPECT_EQ(HostDockSite(X), Site);
}

/// A site that refuses to let its clients go and counts what it heard.
class TGuardedSite : public TPanel, public TDockHandler {
  FK_CLASS(TGuardedSite, TPanel)
public:
  bool DoUnDock(TWinControl*, TControl*) override { return AllowUndock; }
  void CMUnDockClient(TControl* Client, TWinControl* NewTarget) override {
    ++Undocked;
    TDockHandler::CMUnDockClient(Client, NewTarget);
  }
  void CMDockNotification(TControl* Client, TDockNotifyKind Kind) override {
    ++Notified;
    TDockHandler::CMDockNotification(Client, Kind);
  }
  bool AllowUndock = true;
  int Undocked = 0;
  int Notified = 0;
};
FK_IMPLEMENT(TGuardedSite, "DockTreeTest") {}

TEST_F(DockTree, DragsDockFloatAndAskTheSiteTheyLeave) {
  auto* Guarded = CreateComponentOf<TGuardedSite>(Form);
  Guarded->SetParent(Form);
  Guarded->SetBounds(600, 0, 200, 400);
  SetDockSite(Guarded, true);
  SetDockManager(Guarded, New<TDockTree>(Guarded));
  Form->Show();
  TPanel* A = Client("A");
  ManualDock(A, Site);

  {
    // Over the guarded site: its whole client area is the dock rectangle.
    TDockDrag Drag(A);
    Drag.MoveTo(Point(750, 300));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), Guarded);
    EXPECT_TRUE(Drag.Accepted());
    TPoint Origin = Guarded->ClientToScreen(Point(0, 0));
    EXPECT_EQ(Drag.DragObject()->DockRect(), Bounds(Origin.X, Origin.Y, 200, 400));
    EXPECT_TRUE(Drag.DragObject()->ImageVisible());
    ASSERT_TRUE(Drag.Drop());
    EXPECT_FALSE(Drag.DragObject()->ImageVisible());
  }
  EXPECT_EQ(HostDockSite(A), Guarded);
  EXPECT_EQ(A->BoundsRect(), Rect(0, 0, 200, 400));
  A->Hide();
  EXPECT_EQ(Guarded->Notified, 1) << "the site hears a client's visibility change";
  A->Show();

  Guarded->AllowUndock = false;
  {
    TDockDrag Drag(A);
    Drag.MoveTo(Point(2000, 900));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), nullptr);
    EXPECT_FALSE(Drag.Drop()) << "the site keeps its client";
  }
  EXPECT_EQ(HostDockSite(A), Guarded);
  EXPECT_EQ(Guarded->Undocked, 0);

  Guarded->AllowUndock = true;
  {
    TDockDrag Drag(A);
    Drag.MoveTo(Point(1500, 700));
    EXPECT_TRUE(Drag.Drop());
  }
  EXPECT_EQ(HostDockSite(A), nullptr);
  EXPECT_EQ(Guarded->Undocked, 1);
  EXPECT_EQ(A->BoundsRect(), Rect(1500, 700, 1700, 1100)) << "floating at the mouse with its size";

  {
    // A drag that ends without a drop moves nothing.
    TDockDrag Drag(A);
    Drag.MoveTo(Point(150, 150));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), Site);
  }
  EXPECT_EQ(HostDockSite(A), nullptr);
}

TEST(DockGeometry, NearestEdgeAndHalves) {
  TRect R = Rect(0, 0, 200, 100);
  EXPECT_EQ(NearestEdge(R, Point(10, 50)), alLeft);
  EXPECT_EQ(NearestEdge(R, Point(100, 5)), alTop);
  EXPECT_EQ(NearestEdge(R, Point(190, 50)), alRight);
  EXPECT_EQ(NearestEdge(R, Point(100, 95)), alBottom);
  EXPECT_EQ(NearestEdge(R, Point(100, 50)), alLeft) << "ties go to the left";
  EXPECT_EQ(NearestEdge(R, Point(200, 50)), alNone);
  EXPECT_EQ(EdgeHalf(Rect(0, 0, 201, 101), alTop), Rect(0, 0, 201, 51));
  EXPECT_EQ(EdgeHalf(Rect(0, 0, 201, 101), alBottom), Rect(0, 50, 201, 101));
  EXPECT_EQ(EdgeHalf(Rect(0, 0, 201, 101), alLeft), Rect(0, 0, 101, 101));
  EXPECT_EQ(EdgeHalf(Rect(0, 0, 201, 101), alRight), Rect(100, 0, 201, 101));
  EXPECT_EQ(EdgeHalf(Rect(0, 0, 201, 101), alNone), Rect(0, 0, 201, 101));
}

} // namespace
} // namespace formkit::desktoptest
