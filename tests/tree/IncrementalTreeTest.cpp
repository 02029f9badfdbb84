//===- tests/tree/IncrementalTreeTest.cpp - One change, one piece of tree ===//
//
// After its first read a tree follows the designer by reading only what each
// notification concerns: a rename deep in the tree, an insertion (also under a
// parent that gets its sprig later, or one deleted before the read), the
// deletion of a subtree, a control re-parented through the designer's
// selection and a collection that grows. Each time the tree must be the one a
// full read of the module gives, keep the sprigs of everything untouched, and
// figure no sprig the change does not concern.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/design/KilnSprigs.h"
#include "platform/TypInfoBuilder.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

/// A button's sprig that counts how often a sprig of its kind is figured.
class TCountingSprig : public TControlSprig {
  FK_CLASS(TCountingSprig, TControlSprig)
  void FigureParent() override {
    ++Figured;
    inherited::FigureParent();
  }
  static inline int Figured = 0;
};
FK_IMPLEMENT(TCountingSprig, "IncrementalTreeTest") {}

struct IncrementalTreeTest : TreeFixture {
  IncrementalTreeTest() { FrameworkSprigs = true; }

  /// Form1: Panel1 > Panel2 > Panel3 > Button1, and 30 more buttons on Panel1; read once.
  IPtr<IRoot> DeepForm() {
    RegisterSprigType(TButton::StaticClass(), TCountingSprig::StaticClass());
    IPtr<IRoot> Form = NewForm("Form1");
    auto* Panel1 = Add<TPanel>(Form);
    auto* Panel2 = Add<TPanel>(Form, Panel1);
    auto* Panel3 = Add<TPanel>(Form, Panel2);
    Add<TButton>(Form, Panel3);
    for (int I = 0; I < 30; ++I) Add<TButton>(Form, Panel1);
    DesignerOf(Form)->NoSelection(); // a change would figure the selection again
    RootOf(Form);
    TCountingSprig::Figured = 0;
    return Form;
  }
  static TComponent* Named(const IPtr<IRoot>& Root, const char* Name) { return Root->GetRoot()->FindComponent(Name); }
  /// The module's tree after a read of the whole module, which figures every sprig and
  /// makes the missing ones: the same as before when the reads of the changes left
  /// nothing out.
  static String FullRead(const IPtr<IRoot>& Root) {
    TRootSprig* Tree = TreeOf(Root);
    Tree->ItemInserted();
    Tree->Repopulate();
    TCountingSprig::Figured = 0;
    return Draw(Tree);
  }
  static TRootSprig* TreeOf(const IPtr<IRoot>& Root) {
    TRootSprig* Tree = nullptr;
    RootSprigList()->FindRoot(DesignerOf(Root), Tree);
    return Tree;
  }
  /// The module's own tree after its next read, which must be the read of what changed.
  static String Read(const IPtr<IRoot>& Root) {
    TRootSprig* Tree = nullptr;
    RootSprigList()->FindRoot(DesignerOf(Root), Tree);
    Tree->Repopulate();
    return Draw(Tree);
  }
};

TEST_F(IncrementalTreeTest, ARenameDeepInTheTreeFiguresNothingAndKeepsEverySprig) {
  IPtr<IRoot> Form1 = DeepForm();
  TRootSprig* Tree = TreeOf(Form1);
  TComponent* Button1 = Named(Form1, "Button1");
  TSprig* Deep = Tree->Find(Button1);
  ASSERT_EQ(Deep->Path(), "Form1\\Panel1\\Panel2\\Panel3\\Button1");
  EXPECT_EQ(Tree->FindPath("Form1\\Panel1\\Panel2\\Panel3\\Button1"), Deep);

  Button1->SetName("Deepest");
  DesignerOf(Form1)->Modified();
  const String Incremental = Read(Form1);
  EXPECT_EQ(TCountingSprig::Figured, 0) << "a rename moves no sprig";
  EXPECT_EQ(Tree->Find(Button1), Deep);
  EXPECT_EQ(Deep->Caption(), "Deepest");
  EXPECT_EQ(Tree->Find("deepest"), Deep);
  EXPECT_EQ(Tree->FindPath("Form1\\Panel1\\Panel2\\Panel3\\Deepest"), Deep);
  EXPECT_EQ(Tree->FindPath("Form1\\Panel1\\Panel2\\Panel3\\Button1"), nullptr) << "the old path is gone";
  EXPECT_EQ(Incremental, FullRead(Form1));
}

TEST_F(IncrementalTreeTest, AnInsertionFindsItsParentAlsoWhenThatParentGetsItsSprigLater) {
  IPtr<IRoot> Form1 = DeepForm();
  TRootSprig* Tree = TreeOf(Form1);
  TSprig* Panel3 = Tree->Find(Named(Form1, "Panel3"));

  // A button deep in the tree: only its own sprig is figured.
  auto* Deep = Add<TButton>(Form1, static_cast<TPanel*>(Named(Form1, "Panel3")));
  EXPECT_EQ(Tree->Find(Deep), nullptr) << "the insertion is only noted";
  String Incremental = Read(Form1);
  EXPECT_LE(TCountingSprig::Figured, 2) << "one button, figured by two passes at most";
  EXPECT_EQ(Incremental, FullRead(Form1));
  ASSERT_NE(Tree->Find(Deep), nullptr);
  EXPECT_EQ(Tree->Find(Deep)->Parent(), Panel3);
  EXPECT_EQ(Panel3->Items(Panel3->Count() - 1), Tree->Find(Deep)) << "appended after its siblings";

  // A panel made after the first read, and a button on it, told in the same batch.
  auto* Late = Add<TPanel>(Form1);
  auto* OnLate = Add<TButton>(Form1, Late);
  Incremental = Read(Form1);
  EXPECT_LE(TCountingSprig::Figured, 4) << "the new button alone, over a few passes";
  EXPECT_EQ(Tree->Find(OnLate)->Parent(), Tree->Find(Late));
  EXPECT_EQ(Incremental, FullRead(Form1));

  // A button told before its panel: it waits under the root, and moves when the panel
  // joins the module.
  TObjectGuard<TPanel> Outside(CreateComponentOf<TPanel>(nullptr));
  auto* Early = CreateComponentOf<TButton>(Form1->GetRoot());
  Early->SetName("Early");
  Early->SetParent(Outside.Get());
  Read(Form1);
  EXPECT_EQ(Tree->Find(Early)->Parent(), Tree);
  TPanel* Quiet = Outside.Release();
  Form1->GetRoot()->InsertComponent(Quiet);
  Quiet->SetName("Quiet");
  Quiet->SetParent(static_cast<TWinControl*>(Form1->GetRoot()));
  Incremental = Read(Form1);
  EXPECT_EQ(Tree->Find(Early)->Parent(), Tree->Find(Quiet));
  EXPECT_EQ(Incremental, FullRead(Form1));

  // An item deleted before the read that would have made its sprig leaves no trace.
  auto* Brief = Add<TButton>(Form1, Late);
  Brief->Destroy();
  Incremental = Read(Form1);
  EXPECT_EQ(Incremental, FullRead(Form1));
  EXPECT_FALSE(Tree->RepopulateNeeded());
}

TEST_F(IncrementalTreeTest, ADeletedSubtreeIsInvalidAtOnceAndFreedAtTheNextRead) {
  IPtr<IRoot> Form1 = DeepForm();
  TRootSprig* Tree = TreeOf(Form1);
  IPtr<IDesigner> Designer = DesignerOf(Form1);
  auto* Panel2 = Named(Form1, "Panel2");
  TSprig* Panel1Sprig = Tree->Find(Named(Form1, "Panel1"));
  const int Before = Panel1Sprig->Count();
  TSprig* Panel2Sprig = Tree->Find(Panel2);
  TComponent* Button1 = Named(Form1, "Button1");
  ASSERT_EQ(Tree->Find("Button1"), Tree->Find(Button1)); // remembered by name

  Tree->SelectItems({Panel2}, false);
  Designer->DeleteSelection(false);
  EXPECT_TRUE(Panel2Sprig->Invalid());
  EXPECT_EQ(Tree->Find(Button1), nullptr);
  EXPECT_EQ(Tree->Find("Button1"), nullptr) << "the name cache forgot the dead sprig";
  EXPECT_EQ(Panel1Sprig->Count(), Before) << "freed at the next read, not before";
  EXPECT_TRUE(Tree->RepopulateNeeded());

  const String Incremental = Read(Form1);
  EXPECT_LE(TCountingSprig::Figured, 1) << "what the designer selects after the deletion, at most";
  EXPECT_EQ(Panel1Sprig->Count(), Before - 1);
  EXPECT_EQ(Panel1Sprig->IndexOf(Panel2Sprig), -1);
  EXPECT_EQ(Incremental, FullRead(Form1));
  // Told again of the gone item, the tree stays as it is.
  Tree->ItemDeleted(Panel2);
  EXPECT_FALSE(Tree->RepopulateNeeded());
}

TEST_F(IncrementalTreeTest, AChangeReachesTheSelectionAndTheCollectionsAndARefreshReadsTheRest) {
  IPtr<IRoot> Form1 = DeepForm();
  TRootSprig* Tree = TreeOf(Form1);
  IPtr<IDesigner> Designer = DesignerOf(Form1);
  auto* Bar = Add<TStatusBar>(Form1);
  Bar->Panels()->Add()->SetText("Ready");
  auto* Panel3 = static_cast<TPanel*>(Named(Form1, "Panel3"));
  auto* Moved = static_cast<TButton*>(Named(Form1, "Button2"));
  auto* Unseen = static_cast<TButton*>(Named(Form1, "Button3"));
  Read(Form1);

  // The designer moves its selection: the sprig follows at the next read; a collection
  // that grew without notice shows its new item.
  Tree->SelectItems({Moved}, false);
  TCountingSprig::Figured = 0;
  Moved->SetParent(Panel3);
  Bar->Panels()->Add()->SetText("Busy");
  Designer->Modified();
  String Incremental = Read(Form1);
  EXPECT_LE(TCountingSprig::Figured, 2) << "only the selected button";
  EXPECT_EQ(Tree->Find(Moved)->Path(), "Form1\\Panel1\\Panel2\\Panel3\\Button2");
  TSprig* Panels = Tree->Find(Bar->Panels());
  ASSERT_EQ(Panels->Count(), 2);
  EXPECT_EQ(Panels->Items(1)->Caption(), "1 - Busy");
  EXPECT_EQ(Incremental, FullRead(Form1));

  // A collection item that goes without notice is dropped at the change.
  Bar->Panels()->Items(0)->Destroy();
  Designer->Modified();
  EXPECT_EQ(Panels->Count(), 2);
  Read(Form1);
  ASSERT_EQ(Panels->Count(), 1);
  EXPECT_EQ(Panels->Items(0)->Caption(), "0 - Busy");

  // A control moved by code outside the selection is not told: the next refresh, which
  // reads the whole module, finds it.
  Unseen->SetParent(Panel3);
  Designer->Modified();
  EXPECT_EQ(Tree->Find(Unseen)->Parent()->Item(), Named(Form1, "Panel1"));
  Tree->RefreshTreeView();
  EXPECT_EQ(Tree->Find(Unseen)->Parent()->Item(), Panel3);
  EXPECT_EQ(Draw(Tree), FullRead(Form1));
}

} // namespace
} // namespace formkit::fakes
