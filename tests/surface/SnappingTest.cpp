//===- tests/surface/SnappingTest.cpp - Grid, guides and guide lines ------===//
#include "tests/surface/SurfaceFixture.h"

using namespace formkit;
using namespace formkit::fakes;

using TLine = TRecordingPainter::TLine;

namespace formkit::fakes {
void PrintTo(const TLine& L, std::ostream* OS) {
  PrintTo(L.Rect, OS);
  *OS << " type " << int(L.Type);
}
} // namespace formkit::fakes

TEST_F(SurfaceTest, SnapToGridRoundsToTheNearestLineTiesUp) {
  const std::pair<int, int> Origin0[] = {{-5, -8}, {-4, 0}, {3, 0}, {4, 8}, {12, 16}, {-12, -8}, {-13, -16}};
  for (auto [In, Out] : Origin0) EXPECT_EQ(D->SnapToGrid(In, 0, 8, false), Out) << In;
  const std::pair<int, int> Origin3[] = {{6, 3}, {7, 11}, {-1, 3}, {-2, -5}, {-9, -5}, {-10, -13}};
  for (auto [In, Out] : Origin3) EXPECT_EQ(D->SnapToGrid(In, 3, 8, false), Out) << In;
  EXPECT_EQ(D->PointToGrid({-2, 7}, false), (TPoint{0, 8}));
  S->Origin = {3, -3};
  EXPECT_EQ(D->PointToGrid({-2, 7}, false), (TPoint{-5, 5}));
}

TEST_F(SurfaceTest, SnapToGridSwitches) {
  D->SetGridAligned(false);
  EXPECT_EQ(D->SnapToGrid(5, 0, 8, false), 5);
  EXPECT_EQ(D->SnapToGrid(5, 0, 8, true), 8); // Force works with the grid off
  D->SetGridAligned(true);
  S->GridDisabled = true;
  EXPECT_EQ(D->SnapToGrid(5, 0, 8, false), 5);
  EXPECT_EQ(D->SnapToGrid(5, 0, 8, true), 8);
  EXPECT_THROW(D->SnapToGrid(5, 0, 0, true), EArgumentOutOfRangeException);
}

TEST(GuidelinesSorter, PutsBaselinesFirstAndKeepsTheOrderOtherwise) {
  IPtr<TTestGuidelines> G = New<TTestGuidelines>();
  G->Guides = {{gtAlignLeft, 1}, {gtBaseline, 2}, {gtAlignTop, 3}, {gtBaseline, 4}};
  IPtr<IItemGuidelines> Sorted = NewAs<IItemGuidelines, TItemGuidelinesSorter>(IPtr<IItemGuidelines>(G));
  ASSERT_EQ(Sorted->GetCount(), 4);
  const int Offsets[] = {2, 4, 1, 3};
  for (int I = 0; I < 4; ++I) EXPECT_EQ(Sorted->GetDesignerGuideOffset(I), Offsets[I]);
  EXPECT_EQ(Sorted->GetDesignerGuideType(2), gtAlignLeft);
  EXPECT_THROW(Sorted->GetDesignerGuideType(4), EListError);
  IPtr<IItemGuidelines> Empty = NewAs<IItemGuidelines, TItemGuidelinesSorter>(nullptr);
  EXPECT_EQ(Empty->GetCount(), 0);
}

namespace {

/// Guides on: items are placed far from the form's own guides unless a test wants them.
class GuideTest : public SurfaceTest {
protected:
  /// Drags `C` by (DX, DY) from a point inside it and returns where it ended.
  TRect DragBy(TTestControl* C, int DX, int DY) {
    const TPoint From{C->Bounds.Left + 5, C->Bounds.Top + 5};
    const TPoint O = S->ClientOrigin(C->Parent);
    Press(C, From.X + O.X, From.Y + O.Y);
    Move(From.X + O.X + DX, From.Y + O.Y + DY);
    Lines = S->Painter->Lines;
    Release(0, 0);
    return C->Bounds;
  }
  std::vector<TLine> Lines;
};

} // namespace

TEST_F(GuideTest, AlignmentGuideWinsOverTheGrid) {
  S->AddControl(nullptr, "A", Bounds(100, 100, 40, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(200, 200, 60, 20));
  EXPECT_EQ(DragBy(B, -97, 0), Bounds(100, 200, 60, 20)); // the grid says 104
}

TEST_F(GuideTest, LaterGuideWinsAtEqualDistanceAndShowsItsLine) {
  S->AddControl(nullptr, "A", Bounds(100, 100, 40, 20));
  S->AddControl(nullptr, "C", Bounds(106, 300, 30, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(200, 200, 60, 20));
  EXPECT_EQ(DragBy(B, -97, 0), Bounds(106, 200, 60, 20)); // 100 and 106 are both 3 away
  EXPECT_EQ(Lines, (std::vector<TLine>{{TRect{106, 200, 106, 320}, gtAlignLeft}}));
  EXPECT_TRUE(S->Painter->Lines.empty()); // cleared with the drag
}

TEST_F(GuideTest, GuideOneGridStepAwaySnapsOneFurtherDoesNot) {
  S->AddControl(nullptr, "A", Bounds(100, 100, 40, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(200, 200, 60, 20));
  EXPECT_EQ(DragBy(B, -92, 0), Bounds(100, 200, 60, 20)); // 8 away: pulled
  B->Bounds = Bounds(200, 200, 60, 20);
  EXPECT_EQ(DragBy(B, -91, 0), Bounds(112, 200, 60, 20)); // 9 away: the grid
}

TEST_F(GuideTest, BaselineWithinReachBeatsANearerEdge) {
  TTestControl* Label = S->AddControl(nullptr, "Label", Bounds(300, 100, 60, 20));
  Label->Baseline = 14;
  S->AddControl(nullptr, "E", Bounds(420, 102, 30, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(200, 200, 60, 20));
  B->Baseline = 14;
  // E's top is 1 away, the label's baseline 3: the baseline is taken.
  EXPECT_EQ(DragBy(B, 0, -97), Bounds(200, 100, 60, 20));
  EXPECT_EQ(Lines, (std::vector<TLine>{{TRect{200, 114, 360, 114}, gtBaseline},
                                       {TRect{200, 100, 360, 100}, gtAlignTop},
                                       {TRect{200, 119, 360, 119}, gtAlignBottom}}));
}

TEST_F(GuideTest, NeighboursStopAtTheSumOfTheirMargins) {
  TTestControl* A = S->AddControl(nullptr, "A", Bounds(100, 100, 60, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(300, 100, 60, 20));
  A->Margins = B->Margins = TRect{3, 3, 3, 3};
  EXPECT_EQ(DragBy(B, -131, 0), Bounds(166, 100, 60, 20)); // the grid says 172
  EXPECT_EQ(Lines, (std::vector<TLine>{{TRect{100, 100, 226, 100}, gtAlignTop},
                                       {TRect{100, 119, 226, 119}, gtAlignBottom},
                                       {TRect{160, 110, 166, 110}, gtMarginRight}}));
}

TEST_F(GuideTest, MarginsDoNotPullOverlappingOrFarApartItems) {
  TTestControl* A = S->AddControl(nullptr, "A", Bounds(100, 100, 60, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(150, 110, 60, 20));
  A->Margins = B->Margins = TRect{3, 3, 3, 3};
  EXPECT_EQ(DragBy(B, 9, 0), Bounds(158, 110, 60, 20)); // overlapping: the grid, not 166
  B->Bounds = Bounds(300, 300, 60, 20);
  EXPECT_EQ(DragBy(B, -131, 0), Bounds(172, 300, 60, 20)); // far below: the grid, not 166
}

TEST_F(GuideTest, ChildStopsAtItsParentsPadding) {
  TTestControl* Panel = S->AddControl(nullptr, "Panel", Bounds(200, 16, 200, 200), true);
  Panel->Padding = TRect{4, 4, 4, 4};
  TTestControl* X = S->AddControl(Panel, "X", Bounds(20, 20, 60, 20));
  X->Margins = TRect{3, 3, 3, 3};
  EXPECT_EQ(DragBy(X, -15, 0), Bounds(7, 20, 60, 20)); // padding 4 + margin 3; the grid says 4
  EXPECT_EQ(Lines, (std::vector<TLine>{{TRect{200, 46, 207, 46}, gtPaddingLeft}}));
}

TEST_F(GuideTest, FormWithoutPaddingOffersFivePixels) {
  TTestControl* X = S->AddControl(nullptr, "X", Bounds(20, 40, 60, 20));
  X->Margins = TRect{3, 3, 3, 3};
  EXPECT_EQ(DragBy(X, -13, 0), Bounds(8, 40, 60, 20));
}

TEST_F(GuideTest, SelectedItemsAndTheirChildrenOfferNoGuides) {
  TTestControl* Panel = S->AddControl(nullptr, "Panel", Bounds(200, 16, 200, 200), true);
  S->AddControl(Panel, "X", Bounds(20, 20, 60, 20));
  S->AddControl(nullptr, "Other", Bounds(20, 300, 60, 20));
  Press(Panel, 210, 20);
  std::vector<String> Owners;
  for (const TGuideInstance& G : D->VertGuides()) {
    String N = TTestSurface::NameOf(IPtr<IItem>(G.FItem->GetItem()));
    if (Owners.empty() || Owners.back() != N) Owners.push_back(N);
  }
  // Sorted by position: the form's guides surround Other's.
  EXPECT_EQ(std::count(Owners.begin(), Owners.end(), "Panel"), 0);
  EXPECT_EQ(std::count(Owners.begin(), Owners.end(), "X"), 0);
  EXPECT_EQ(std::count(Owners.begin(), Owners.end(), "Other"), 1);
  EXPECT_EQ(D->VertGuides().size(), 4u + 6u); // Other's edges and margins; the form's with padding
  Release(210, 20);
  EXPECT_TRUE(D->VertGuides().empty());
}

TEST_F(GuideTest, GuidesOffMeansTheGrid) {
  S->AddControl(nullptr, "A", Bounds(100, 100, 40, 20));
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(200, 200, 60, 20));
  D->SetGuidelines(false);
  EXPECT_EQ(DragBy(B, -97, 0), Bounds(104, 200, 60, 20));
  EXPECT_TRUE(Lines.empty());
  D->SetGuidelines(true);
  S->ShowGuides = false; // no painter: no guide steps either
  B->Bounds = Bounds(200, 200, 60, 20);
  EXPECT_EQ(DragBy(B, -97, 0), Bounds(104, 200, 60, 20));
}

TEST_F(GuideTest, SizingSnapsAnEdgeToAGuide) {
  S->AddControl(nullptr, "A", Bounds(100, 100, 40, 20)); // right guide at 139
  TTestControl* B = S->AddControl(nullptr, "B", Bounds(100, 200, 30, 20));
  SelectOnly(B);
  Press(B, 130, 210, {}, {gaRight});
  Move(139, 210);
  Release(139, 210);
  EXPECT_EQ(B->Bounds, (TRect{100, 200, 140, 220})); // right edges aligned; the grid says 137
}
