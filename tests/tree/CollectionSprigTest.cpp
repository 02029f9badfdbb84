//===- tests/tree/CollectionSprigTest.cpp - Collections in the tree ------===//
//
// A status bar's panels: the collection node with its items in the
// collection's order, items dragged and moved among their siblings only,
// "Add item" on the collection and on its items, and the deletion of a
// collection node that clears the collection.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnComCtrls.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

struct CollectionSprigTest : TreeFixture {
  /// Form1 with StatusBar1 of the panels "A", "B", "C" and StatusBar2 of one panel "Z".
  void SetUp() override {
    TreeFixture::SetUp();
    Form1 = NewForm("Form1");
    Bar1 = Add<TStatusBar>(Form1);
    for (const char* Text : {"A", "B", "C"}) Bar1->Panels()->Add()->SetText(Text);
    Bar2 = Add<TStatusBar>(Form1);
    Bar2->Panels()->Add()->SetText("Z");
    Root = RootOf(Form1);
    Panels1 = Root->Find(Bar1->Panels());
    Panels2 = Root->Find(Bar2->Panels());
  }
  static String Order(TSprig* Collection) {
    String Text;
    for (int I = 0; I < Collection->Count(); ++I) Text += Collection->Items(I)->Caption() + ";";
    return Text;
  }
  static String Texts(TStatusBar* Bar) {
    String Text;
    for (int I = 0; I < Bar->Panels()->Count(); ++I) Text += Bar->Panels()->Items(I)->Text();
    return Text;
  }
  IPtr<IRoot> Form1;
  TStatusBar* Bar1 = nullptr;
  TStatusBar* Bar2 = nullptr;
  TRootSprig* Root = nullptr;
  TSprig* Panels1 = nullptr;
  TSprig* Panels2 = nullptr;
};

TEST_F(CollectionSprigTest, ItemsAreDraggedAndMovedAmongTheirSiblingsOnly) {
  ASSERT_TRUE(Panels1 && Panels2);
  EXPECT_EQ(Order(Panels1), "0 - A;1 - B;2 - C;");
  TSprig* A = Panels1->Items(0);
  TSprig* C = Panels1->Items(2);
  TSprig* Z = Panels2->Items(0);
  EXPECT_EQ(C->ItemIndex(), 2);
  EXPECT_FALSE(A->Ghosted());
  EXPECT_FALSE(Panels1->Ghosted());

  // Item 2 dragged onto item 0: the collection and the nodes follow, 2, 0, 1.
  EXPECT_TRUE(A->DragOver(C));
  EXPECT_TRUE(A->DragDrop(C));
  EXPECT_EQ(Texts(Bar1), "CAB");
  EXPECT_EQ(Order(Panels1), "0 - C;1 - A;2 - B;");
  EXPECT_FALSE(C->DragDrop(C)) << "onto itself: no change of order";
  // Another collection's item is refused, and changes nothing.
  EXPECT_FALSE(Z->DragOver(A));
  EXPECT_FALSE(Z->DragDrop(A));
  EXPECT_FALSE(Panels1->DragOver(A));
  EXPECT_EQ(Texts(Bar2), "Z");

  // Moving through the host's view: only a node that has a parent there moves, and only
  // where there is a neighbour.
  IPtr<TStructureViewHost> View = OfferView();
  IPtr<IOTAStructureNode> ParentNode = NodeFor(Panels1);
  NodeFor(A);
  EXPECT_FALSE(A->CanMove(true)) << "its node has no parent in the view";
  NodeFor(A, ParentNode);
  NodeFor(C, ParentNode);
  EXPECT_TRUE(A->CanMove(true));
  EXPECT_TRUE(A->CanMove(false));
  EXPECT_FALSE(C->CanMove(true)) << "first already";
  EXPECT_FALSE(Panels1->CanMove(true)) << "a component's children are not in index order";
  EXPECT_TRUE(A->Move(true));
  EXPECT_EQ(Texts(Bar1), "ACB");
  EXPECT_EQ(Order(Panels1), "0 - A;1 - C;2 - B;");
  EXPECT_FALSE(A->Move(true)) << "no neighbour above";
  EXPECT_EQ(Root->UpdateLocks(), 0);
}

TEST_F(CollectionSprigTest, AddItemWorksOnTheCollectionAndOnItsItemsAndFigureChildrenAddsOnlyWhatIsNew) {
  TSprig* B = Panels1->Items(1);
  EXPECT_EQ(B->AddTypeCount(), 1);
  EXPECT_EQ(B->GetAddType(0), "Add item");
  B->AddType(0);
  EXPECT_EQ(Bar1->Panels()->Count(), 4);
  EXPECT_EQ(Bar2->Panels()->Count(), 1);

  // The new item gets its node at the next figuring, once.
  Panels1->FigureChildren();
  EXPECT_EQ(Panels1->Count(), 4);
  Panels1->FigureChildren();
  EXPECT_EQ(Panels1->Count(), 4);
  EXPECT_EQ(Order(Panels1), "0 - A;1 - B;2 - C;3 - TStatusPanel;");
  // A bar's own sprig finds its collection once.
  TSprig* BarSprig = Root->Find(Bar1);
  EXPECT_EQ(BarSprig->Count(), 1);
  BarSprig->FigureChildren();
  EXPECT_EQ(BarSprig->Count(), 1);
}

TEST_F(CollectionSprigTest, DeletingACollectionNodeClearsTheCollectionAndLeavesTheNode) {
  EXPECT_TRUE(Panels1->CustomDelete());
  EXPECT_EQ(Bar1->Panels()->Count(), 0);
  EXPECT_FALSE(Panels1->CustomDelete()) << "an empty collection is left alone";
  // The designer tells of the items' end; the node stays, empty.
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(Tree(Form1), "Form1\n"
                         "  StatusBar1\n"
                         "    Panels\n"
                         "  StatusBar2\n"
                         "    Panels\n"
                         "      0 - Z\n");
  EXPECT_EQ(Panels1->DeleteStyle(), dsCustom);
  EXPECT_EQ(Panels2->Items(0)->DeleteStyle(), dsNormal);
}

} // namespace
} // namespace formkit::fakes
