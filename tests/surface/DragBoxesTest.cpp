//===- tests/surface/DragBoxesTest.cpp - XOR drag boxes -------------------===//
#include "tests/surface/SurfaceFixture.h"

using namespace formkit;
using namespace formkit::fakes;

TEST(XorDragBoxes, ArraysDoubleAndAddReturnsTheIndex) {
  IPtr<TTestDragBoxes> B = New<TTestDragBoxes>();
  EXPECT_EQ(B->Capacity(), 0);
  std::vector<int> Capacities;
  for (int I = 0; I < 5; ++I) {
    EXPECT_EQ(B->Add(Bounds(I * 10, 0, 5, 5), dbsItem, daMove), I);
    Capacities.push_back(B->Capacity());
  }
  EXPECT_EQ(Capacities, (std::vector<int>{2, 2, 4, 4, 8}));
  EXPECT_EQ(B->Visible().size(), 5u); // each drawn once
  B->Done();
  EXPECT_TRUE(B->Visible().empty());
  EXPECT_EQ(B->Used(), 0);
  EXPECT_EQ(B->Capacity(), 8); // the arrays keep their length
}

TEST(XorDragBoxes, DoneOnNothingDrawsNothing) {
  IPtr<TTestDragBoxes> B = New<TTestDragBoxes>();
  B->Done();
  EXPECT_TRUE(B->Draws.empty());
  EXPECT_EQ(B->Capacity(), 0);
  EXPECT_EQ(B->BoundingRect(), (TRect{2147483647, 2147483647, -2147483647, -2147483647}));
}

TEST(XorDragBoxes, BoundingRectIsTheUnion) {
  IPtr<TTestDragBoxes> B = New<TTestDragBoxes>();
  B->Add(TRect{10, 20, 30, 40}, dbsItem, daMove);
  EXPECT_EQ(B->BoundingRect(), (TRect{10, 20, 30, 40}));
  B->Add(TRect{-5, 25, 12, 60}, dbsItem, daMove);
  EXPECT_EQ(B->BoundingRect(), (TRect{-5, 20, 30, 60}));
}

TEST(XorDragBoxes, ChangeErasesRedrawsAndCounts) {
  DragChangeCounter() = 0;
  IPtr<TTestDragBoxes> B = New<TTestDragBoxes>();
  B->Add(TRect{0, 0, 10, 10}, dbsSelection, daSelect);
  B->Change(0, TRect{0, 0, 10, 10}, daSelect); // the same rectangle still counts
  B->Change(0, TRect{0, 0, 20, 20}, daSelect);
  B->Change(3, TRect{0, 0, 30, 30}, daSelect); // no such box: ignored, but counted
  EXPECT_EQ(DragChangeCounter(), 3);
  EXPECT_EQ(B->Visible(), (std::vector<TRect>{TRect{0, 0, 20, 20}}));
  EXPECT_EQ(B->Draws.size(), 5u);
  B->MoveBy(5, -5, daMove);
  EXPECT_EQ(B->Visible(), (std::vector<TRect>{TRect{5, -5, 25, 15}}));
  EXPECT_EQ(B->Draws.size(), 7u); // all erased and redrawn
  DragChangeCounter() = 0;
}

namespace {
class TImage : public TInterfacedObject, public IDragImage {
  FK_CLASS(TImage, TInterfacedObject)
  FK_INTERFACES(IDragImage)
  void DrawImage() override {}
};
FK_IMPLEMENT(TImage, "Tests") {}
} // namespace

TEST(XorDragBoxes, ImagesAreCarriedAndReleasedAtDone) {
  IPtr<TTestDragBoxes> B = New<TTestDragBoxes>();
  IPtr<TImage> Image = New<TImage>();
  const int Before = Image->RefCount();
  B->Add(TRect{0, 0, 4, 4}, IPtr<IDragImage>(Image), dbsItem, daMove);
  EXPECT_EQ(B->Draws.back(), "Draw(0,0,4,4,item)Image");
  EXPECT_EQ(Image->RefCount(), Before + 1);
  B->Done();
  EXPECT_EQ(Image->RefCount(), Before);
}

TEST_F(SurfaceTest, WholeItemsAreHandedToTheBoxesAsItems) {
  TTestControl* C = S->AddControl(nullptr, "Shape1", Bounds(40, 40, 20, 20));
  C->Whole = true;
  D->SetGuidelines(false);
  Press(C, 45, 45);
  EXPECT_EQ(S->Boxes->Visible(), (std::vector<TRect>{Bounds(40, 40, 20, 20)}));
  Move(53, 45);
  EXPECT_EQ(S->Boxes->Visible(), (std::vector<TRect>{Bounds(48, 40, 20, 20)}));
  Release(53, 45);
  EXPECT_EQ(C->Bounds, Bounds(48, 40, 20, 20));
}
