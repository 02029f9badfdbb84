//===- tests/tree/ModuleTreeTest.cpp - The tree of a real module ---------===//
//
// Kiln forms on the Kiln designer: the tree nests controls under their
// parents whatever order they were made in, shows non-visual components under
// the root and collections with their items under their components, leaves
// transient components out, and follows insertions, deletions, renames,
// changes and selections made through the designer without a rebuild.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnComCtrls.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

struct ModuleTreeTest : TreeFixture {
  /// Form "Name": Panel1 holding Panel2 holding Label1, Timer1, and StatusBar1 with the
  /// panels "Ready" and one without text. With `Scrambled`, the label is made first, on
  /// the form, and moved into Panel2 at the end.
  IPtr<IRoot> NestedForm(const String& Name, bool Scrambled) {
    IPtr<IRoot> Form = NewForm(Name);
    TLabel* Label = Scrambled ? Add<TLabel>(Form) : nullptr;
    auto* Panel1 = Add<TPanel>(Form);
    auto* Panel2 = Add<TPanel>(Form, Panel1);
    if (Scrambled) Label->SetParent(Panel2);
    else Add<TLabel>(Form, Panel2);
    Add<TTimer>(Form);
    auto* Bar = Add<TStatusBar>(Form);
    Bar->Panels()->Add()->SetText("Ready");
    Bar->Panels()->Add();
    return Form;
  }
  static TComponent* Named(const IPtr<IRoot>& Root, const char* Name) { return Root->GetRoot()->FindComponent(Name); }
};

constexpr const char* NestedTree = "  Panel1\n"
                                   "    Panel2\n"
                                   "      Label1\n"
                                   "  Timer1\n"
                                   "  StatusBar1\n"
                                   "    Panels\n"
                                   "      0 - Ready\n"
                                   "      1 - TStatusPanel\n";

TEST_F(ModuleTreeTest, ComponentsNestUnderTheirParentsWhateverTheOrderTheyWereMadeIn) {
  IPtr<IRoot> Form1 = NestedForm("Form1", true);
  IPtr<IRoot> Form2 = NestedForm("Form2", false);
  // The label stands before its panels among the form's components, and still nests.
  EXPECT_EQ(Form1->GetRoot()->Components(0), Named(Form1, "Label1"));
  EXPECT_EQ(Tree(Form1), String("Form1\n") + NestedTree);
  EXPECT_EQ(Tree(Form2), String("Form2\n") + NestedTree);

  TRootSprig* Root = RootOf(Form1);
  TSprig* Label = Root->Find(Named(Form1, "Label1"));
  ASSERT_NE(Label, nullptr);
  EXPECT_EQ(Label->Path(), "Form1\\Panel1\\Panel2\\Label1");
  EXPECT_EQ(Label->Root(), Root);
  EXPECT_EQ(Label->GetImageIndex(), SprigImageComponent);
  EXPECT_EQ(Root->GetImageIndex(), SprigImageItem);
  EXPECT_EQ(Root->FindPath("FORM1\\panel1\\PANEL2"), Root->Find(Named(Form1, "Panel2")));
  EXPECT_EQ(Root->Find("Label1", false), nullptr) << "not a direct child of the root";
  EXPECT_EQ(Root->Find("label1"), Label);
  EXPECT_EQ(Root->Find("Label1", false), Label) << "a remembered hit answers first";
  EXPECT_EQ(Root->Find("Label1", TButton::StaticClass()), nullptr);
  EXPECT_EQ(Root->Find("Label1", TLabel::StaticClass()), Label);
  EXPECT_EQ(Root->Find(Named(Form1, "Label1"), false), nullptr);
  EXPECT_EQ(Root->Find(Named(Form1, "Timer1"), false)->Name(), "Timer1");
  EXPECT_EQ(Root->Find(static_cast<TPersistent*>(nullptr)), nullptr);
  EXPECT_EQ(Root->Find(Form1->GetRoot()), Root);
  EXPECT_EQ(Root->Find("Form1"), Root);
  EXPECT_EQ(Root->Find(""), nullptr);
  EXPECT_EQ(Label->SeekParent(static_cast<TPersistent*>(nullptr), true), Root);
  // Hits are remembered; a sprig that goes leaves the caches.
  EXPECT_EQ(Root->NamedCacheSize(), 1);
  EXPECT_EQ(Root->PathedCacheSize(), 1);

  // The collection node and its items.
  TSprig* Panels = Root->FindPath("Form1\\StatusBar1\\<Collection.Panels>");
  ASSERT_NE(Panels, nullptr);
  EXPECT_EQ(Panels->Name(), "<Collection.Panels>");
  EXPECT_EQ(Panels->GetImageIndex(), SprigImageCollection);
  EXPECT_EQ(Panels->DeleteStyle(), dsCustom);
  EXPECT_EQ(Panels->GetAddType(0), "Add item");
  EXPECT_EQ(Panels->Owner(), Root->Find(Named(Form1, "StatusBar1")));
  EXPECT_EQ(Panels->Items(1)->Path(), "Form1\\StatusBar1\\<Collection.Panels>\\TStatusPanel");
  EXPECT_EQ(Panels->Items(0)->GetImageIndex(), SprigImageItem);

  // Class names join the captions when asked for.
  GShowClassNameInTreeView = true;
  EXPECT_EQ(Label->Caption(), "Label1 (TLabel)");
  EXPECT_EQ(Label->CaptionFor("", "Owner1", ""), "<?> {Owner1} (TLabel)");
  EXPECT_EQ(Label->CaptionFor("x", "", "TThing"), "x (TThing)");
  GShowClassNameInTreeView = false;
  EXPECT_EQ(Label->CaptionFor("", "Owner1", ""), "<?> {Owner1}");
  EXPECT_EQ(Label->CaptionFor("Click", "Button1"), "Click {Button1}");
}

TEST_F(ModuleTreeTest, TransientAndUnshownComponentsGetNoNodeAndAClassWithoutASprigStaysOut) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Hidden = Add<TTimer>(Form1);
  Hidden->SetComponentStyle(Hidden->ComponentStyle() + TComponentStyle{csTransient});
  Add<TButton>(Form1);
  EXPECT_EQ(Tree(Form1), "Form1\n  Button1\n");

  // A class whose registered sprig is no component sprig gets none.
  RegisterSprigType(TTimer::StaticClass(), TPersistentSprig::StaticClass());
  Add<TTimer>(Form1);
  EXPECT_EQ(Tree(Form1), "Form1\n  Button1\n");
  // A component without a name shows its place among the owner's components.
  Add<TButton>(Form1)->SetName("");
  EXPECT_EQ(Tree(Form1), "Form1\n  Button1\n  <Components[3]>\n");
}

TEST_F(ModuleTreeTest, TheTreeFollowsInsertionsDeletionsRenamesChangesAndSelectionsOfTheDesigner) {
  IPtr<IRoot> Form1 = NestedForm("Form1", true);
  TRootSprig* Root = RootOf(Form1);
  auto* Panel1 = static_cast<TPanel*>(Named(Form1, "Panel1"));
  TSprig* Panel1Sprig = Root->Find(Panel1);
  TSprig* LabelSprig = Root->Find(Named(Form1, "Label1"));
  EXPECT_FALSE(Root->RepopulateNeeded());

  // An insertion only marks the tree; the next refresh adds the one new sprig and keeps
  // the others.
  auto* Button = Add<TButton>(Form1, Panel1);
  EXPECT_TRUE(Root->RepopulateNeeded());
  EXPECT_EQ(Root->Find(Button), nullptr);
  EXPECT_TRUE(Root->Repopulate());
  EXPECT_FALSE(Root->Repopulate()) << "nothing owed";
  EXPECT_EQ(Root->Find(Button)->Path(), "Form1\\Panel1\\Button1");
  EXPECT_EQ(Root->Find(Panel1), Panel1Sprig);
  EXPECT_EQ(Root->Find(Named(Form1, "Label1")), LabelSprig);

  // A rename reaches the caption and the searches by name.
  EXPECT_EQ(Root->Find("Label1"), LabelSprig);
  Named(Form1, "Label1")->SetName("Title");
  EXPECT_EQ(Tree(Form1), "Form1\n"
                         "  Panel1\n"
                         "    Panel2\n"
                         "      Title\n"
                         "    Button1\n"
                         "  Timer1\n"
                         "  StatusBar1\n"
                         "    Panels\n"
                         "      0 - Ready\n"
                         "      1 - TStatusPanel\n");
  EXPECT_EQ(Root->Find("Label1"), nullptr);
  EXPECT_EQ(Root->Find("Title"), LabelSprig);

  // A change of order in a collection, told by the designer, re-sorts the item nodes.
  auto* Bar = static_cast<TStatusBar*>(Named(Form1, "StatusBar1"));
  Bar->Panels()->Items(1)->SetIndex(0);
  DesignerOf(Form1)->Modified();
  TSprig* Panels = Root->Find(Bar->Panels());
  EXPECT_EQ(Panels->Items(0)->Caption(), "0 - TStatusPanel");
  EXPECT_EQ(Panels->Items(1)->Caption(), "1 - Ready");

  // A control moved to another parent moves its node at the next refresh.
  Button->SetParent(static_cast<TPanel*>(Named(Form1, "Panel2")));
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(RootOf(Form1)->Find(Button)->Path(), "Form1\\Panel1\\Panel2\\Button1");

  // A deletion invalidates the node and its subtree at once; the refresh frees them.
  IPtr<IDesigner> Designer = DesignerOf(Form1);
  Root->SelectItems({Panel1}, false);
  EXPECT_EQ(Root->Find(Button)->Invalid(), false);
  Designer->DeleteSelection(false);
  EXPECT_EQ(Root->Find(Button), nullptr);
  EXPECT_EQ(Root->Find(Named(Form1, "Title")), nullptr);
  EXPECT_TRUE(Panel1Sprig->Invalid());
  EXPECT_EQ(Panel1Sprig->Item(), nullptr);
  EXPECT_EQ(Root->Find("Title"), nullptr) << "the name cache forgot the dead sprig";
  EXPECT_EQ(Tree(Form1), "Form1\n  Timer1\n  StatusBar1\n    Panels\n      0 - TStatusPanel\n      1 - Ready\n");
  // Told again of the same item, or of the root's own, the tree stays as it is.
  Root->ItemDeleted(Panel1);
  EXPECT_FALSE(Root->RepopulateNeeded());
  Root->ItemDeleted(Form1->GetRoot());
  EXPECT_FALSE(Root->RepopulateNeeded());
  EXPECT_FALSE(Root->Invalid());

  // Selecting through the tree selects in the designer, in the order given.
  auto* Timer = Named(Form1, "Timer1");
  Root->Find(Bar)->SelectItems({Bar, Timer});
  IPtr<TDesignerSelections> Selected = New<TDesignerSelections>();
  Designer->GetSelections(InterfaceOf<IDesignerSelections>(Selected.Get()));
  ASSERT_EQ(Selected->GetCount(), 2);
  EXPECT_EQ(Selected->Get(0), Bar);
  EXPECT_EQ(Selected->Get(1), Timer);
}

TEST_F(ModuleTreeTest, ANestedFrameIsANodeOfTheFormAndItsOwnComponentsStayInItsModule) {
  IPtr<IRoot> Frame1 = OpenModule("Frame1", "Frame");
  Add<TButton>(Frame1);
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  TComponent* Frame = KilnRoot(Form1)->FrameCreateComponent(Frame1->GetRoot()->ClassType(), Form1->GetRoot());
  ASSERT_NE(Frame, nullptr);
  static_cast<TControl*>(Frame)->SetParent(Panel);
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n    " + Frame->Name() + "\n");
  EXPECT_EQ(Tree(Frame1), "Frame1\n  Button1\n");
  EXPECT_EQ(RootOf(Form1)->Find(Frame->Components(0)), nullptr);
}

TEST_F(ModuleTreeTest, EachOpenDesignerHasOneRootSprigThatGoesWithIt) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  IPtr<IRoot> Form2 = NewForm("Form2");
  EXPECT_EQ(RootSprigList()->Count(), 2);
  TRootSprig* First = RootOf(Form1);
  ASSERT_NE(First, nullptr);
  IPtr<IDesigner> Designer = DesignerOf(Form1);
  IPtr<IDesigner> Got;
  EXPECT_TRUE(First->GetDesigner(Got));
  EXPECT_EQ(Got.Get(), Designer.Get());
  // A second opening of the same designer keeps the sprig it has.
  RootSprigList()->DesignerOpened(Designer, false);
  EXPECT_EQ(RootOf(Form1), First);
  EXPECT_EQ(RootSprigList()->Count(), 2);
  RootSprigList()->DesignerOpened(nullptr, false);
  TRootSprig* None = nullptr;
  EXPECT_FALSE(RootSprigList()->FindRoot(nullptr, None));
  Form2->Close();
  EXPECT_EQ(RootSprigList()->Count(), 1);
  EXPECT_EQ(RootOf(Form1), First);
}

} // namespace
} // namespace formkit::fakes
