//===- tests/tree/SprigCoreTest.cpp - Sprigs and informants --------------===//
//
// Informant links and their notices; where `Add` puts a sprig and what it
// refuses; indexes, walks and item-less sprigs; captions on their way to a
// widget node and the node's life beside its sprig; parenting through a
// property, with its problem state, drag rules and palette rule; components
// made through a sprig.
//
//===----------------------------------------------------------------------===//
#include "platform/TypInfoBuilder.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

/// Records whom it was told of.
class TListeningInformant : public TInformant {
  FK_CLASS(TListeningInformant, TInformant)
  void Changed(TInformant* ASender) override {
    Heard.push_back(ASender);
    inherited::Changed(ASender);
  }
  std::vector<TInformant*> Heard;
};
FK_IMPLEMENT(TListeningInformant, "SprigCoreTest") {}

/// Shows a label under the control it focuses.
class TFocusLabelSprig : public TComponentSprig {
  FK_CLASS(TFocusLabelSprig, TComponentSprig)
  String ParentProperty() override { return "FocusControl"; }
};
FK_IMPLEMENT(TFocusLabelSprig, "SprigCoreTest") {}

/// A tree-owning editor over a headless tree view.
class TTreeEditor : public TInterfacedObject, public ISprigDesigner {
  FK_CLASS(TTreeEditor, TInterfacedObject)
  FK_INTERFACES(ISprigDesigner)
  TTreeEditor() : View(new TCustomTreeView()) {}
  TCustomTreeView* GetTreeView() override { return View.Get(); }
  void BeforeItemsModified() override {}
  void AfterItemsModified() override {}
  void ItemsChanged() override {}
  void SetRootSprig(TRootSprig* ARootSprig) override { Shown.push_back(ARootSprig); }
  /// Gives each sprig of the tree a node, parents first.
  void Populate(TSprig* Sprig, TTreeNode* Parent = nullptr) {
    TTreeNode* Node = View->AddNode(Parent, "", TSprigTreeNode::StaticClass());
    Sprig->SetTreeNode(Node);
    Sprig->VisualRefresh();
    for (int I = 0; I < Sprig->Count(); ++I) Populate(Sprig->Items(I), Node);
  }
  TObjectGuard<TCustomTreeView> View;
  std::vector<TRootSprig*> Shown;
};
FK_IMPLEMENT(TTreeEditor, "SprigCoreTest") {}

using SprigCoreTest = TreeFixture;

TEST_F(SprigCoreTest, InformantsLinkBothWaysAndTellEachOtherUntilOneGoes) {
  TObjectGuard<TListeningInformant> A(new TListeningInformant());
  TObjectGuard<TListeningInformant> B(new TListeningInformant());
  TObjectGuard<TListeningInformant> C(new TListeningInformant());
  A->Notify(B.Get());
  A->Notify(C.Get());
  A->Notify(B.Get()); // once only
  EXPECT_EQ(A->Linked(), (std::vector<TInformant*>{B.Get(), C.Get()}));
  EXPECT_EQ(B->Linked(), std::vector<TInformant*>{A.Get()});

  A->Notification(); // last linked first
  EXPECT_EQ(C->Heard, std::vector<TInformant*>{A.Get()});
  EXPECT_EQ(B->Heard, std::vector<TInformant*>{A.Get()});
  // While notices are off they are owed, and paid when the last suppression ends.
  A->DisableNotify();
  A->DisableNotify();
  A->Notification();
  A->EnableNotify();
  EXPECT_EQ(B->Heard.size(), 1u);
  A->EnableNotify();
  EXPECT_EQ(B->Heard.size(), 2u);
  A->EnableNotify(); // more ends than beginnings change nothing
  EXPECT_EQ(B->Heard.size(), 2u);

  // An informant that goes tells the others, and the links break.
  B.Reset();
  EXPECT_EQ(A->Linked(), std::vector<TInformant*>{C.Get()});
  EXPECT_EQ(A->Heard.size(), 1u);
  A->Unnotify(C.Get());
  EXPECT_TRUE(A->Linked().empty());
  EXPECT_TRUE(C->Linked().empty());
  A->Notification(); // nobody to tell: owed, harmlessly
  EXPECT_EQ(C->Heard.size(), 2u);
}

TEST_F(SprigCoreTest, AddPlacesASprigOnceAndNeverUnderItself) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1, Panel);
  TRootSprig* Root = RootOf(Form1);
  TSprig* PanelSprig = Root->Find(Panel);
  TSprig* ButtonSprig = Root->Find(Button);
  ASSERT_EQ(ButtonSprig->Parent(), PanelSprig);
  // Its own parent, itself, one above it: nothing changes.
  EXPECT_EQ(PanelSprig->Add(ButtonSprig), ButtonSprig);
  EXPECT_EQ(ButtonSprig->Add(ButtonSprig), ButtonSprig);
  EXPECT_EQ(ButtonSprig->Add(PanelSprig), PanelSprig);
  EXPECT_EQ(ButtonSprig->Add(Root), Root);
  EXPECT_EQ(PanelSprig->Parent(), Root);
  EXPECT_EQ(ButtonSprig->Count(), 0);
  EXPECT_EQ(ButtonSprig->Items(0), nullptr);
  EXPECT_EQ(ButtonSprig->IndexOf(PanelSprig), -1);
  EXPECT_TRUE(Root->Parents(ButtonSprig));
  EXPECT_FALSE(ButtonSprig->Parents(Root));
  EXPECT_EQ(Root->Index(), -1);

  // Indexes are clipped to the list.
  TSprig* Extra1 = Root->Add(NewSprig(TAbstractSprig::StaticClass(), nullptr).Release());
  TSprig* Extra2 = Root->Add(NewSprig(TAbstractSprig::StaticClass(), nullptr).Release());
  EXPECT_EQ(Extra2->Index(), 2);
  Extra2->SetIndex(-5);
  EXPECT_EQ(Extra2->Index(), 0);
  Root->SetIndexOf(Extra2, 99);
  EXPECT_EQ(Extra2->Index(), 2);
  EXPECT_EQ(Extra1->Root(), Root);
  Root->SetIndexOf(ButtonSprig, 0); // not a child: nothing
  EXPECT_EQ(Root->IndexOf(ButtonSprig), -1);

  // An item-less sprig is hidden without asking, aborts deletion and offers no menus.
  EXPECT_TRUE(Extra1->Hidden());
  EXPECT_TRUE(Extra1->Ghosted() == false);
  EXPECT_EQ(Extra1->DeleteStyle(), dsAbort);
  EXPECT_FALSE(Extra1->ShowRegisteredMenus());
  EXPECT_EQ(Extra1->GetImageIndex(), SprigImageNone);
  EXPECT_EQ(Extra1->FocusItem(), Form1->GetRoot());
  EXPECT_EQ(Extra1->UniqueName(), "");
  EXPECT_FALSE(Extra1->CanAdd());
  EXPECT_TRUE(ButtonSprig->ShowRegisteredMenus());
  EXPECT_FALSE(ButtonSprig->Hidden());
  EXPECT_EQ(ButtonSprig->DeleteStyle(), dsNormal);

  // Transient grouping nodes live only while they have children.
  TSprig* Group = Root->Add(NewSprig(TTransientCollectionSprig::StaticClass(), nullptr).Release());
  EXPECT_EQ(Group->GetImageIndex(), SprigImageAbstractCollection);
  EXPECT_TRUE(Group->Transient());
  TSprig* Kept = Root->Add(NewSprig(TTransientSprig::StaticClass(), nullptr).Release());
  Kept->Add(Extra1);
  EXPECT_EQ(NewSprig(TAbstractCollectionSprig::StaticClass(), nullptr)->GetImageIndex(), SprigImageAbstractCollection);
  Root->ClearUnneededSprigs();
  EXPECT_EQ(Root->IndexOf(Group), -1);
  EXPECT_EQ(Extra1->Parent(), Kept);

  // A walk skips an invalid sprig with everything below it.
  std::vector<TSprig*> Before, After;
  PanelSprig->Invalidate();
  PanelSprig->Invalidate(); // once only
  Root->ForEach([&](TSprig* S) { Before.push_back(S); }, [&](TSprig* S) { After.push_back(S); });
  EXPECT_EQ(std::count(Before.begin(), Before.end(), PanelSprig), 0);
  EXPECT_EQ(std::count(Before.begin(), Before.end(), ButtonSprig), 0);
  EXPECT_TRUE(ButtonSprig->Invalid());
  EXPECT_EQ(Before.front(), Root);
  EXPECT_EQ(After.back(), Root);
  EXPECT_EQ(Before.size(), After.size());
  EXPECT_EQ(Root->Find(Button), nullptr);

  // A sprig of a class that is none is refused by name.
  try {
    (void)NewSprig(TPanel::StaticClass(), nullptr);
    FAIL() << "made a sprig of a control class";
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "TPanel is not a sprig class");
  }
}

TEST_F(SprigCoreTest, SprigsOfEqualIndexStandInReverseOrderOfInsertion) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  TRootSprig* Root = RootOf(Form1);
  TSprig* Sorted = Root->Add(NewSprig(TCollectionSprig::StaticClass(), nullptr).Release());
  TSprig* First = Sorted->Add(NewSprig(TAbstractSprig::StaticClass(), nullptr).Release());
  TSprig* Second = Sorted->Add(NewSprig(TAbstractSprig::StaticClass(), nullptr).Release());
  EXPECT_EQ(Sorted->Items(0), Second);
  EXPECT_EQ(Sorted->Items(1), First);
  Sorted->SortItems(); // sprigs without items keep their places
  EXPECT_EQ(Sorted->Items(0), Second);
}

TEST_F(SprigCoreTest, CaptionsReachTheNodeClippedAndNodesAndSprigsForgetEachOtherAsEitherGoes) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1, Panel);
  const String Long79 = "B" + String(78, 'x');
  Button->SetName(Long79);
  TRootSprig* Root = RootOf(Form1);
  IPtr<TTreeEditor> Editor = New<TTreeEditor>();
  Root->SetSprigDesigner(InterfaceOf<ISprigDesigner>(Editor.Get()));
  EXPECT_EQ(Root->TreeView(), Editor->View.Get());
  Editor->Populate(Root);
  TSprig* ButtonSprig = Root->Find(Button);
  TTreeNode* Node = ButtonSprig->TreeNode();
  ASSERT_NE(Node, nullptr);
  EXPECT_EQ(Node->Data, ButtonSprig);
  EXPECT_EQ(Node->Text, Long79) << "79 characters reach the node whole";
  EXPECT_EQ(Node->ImageIndex, SprigImageComponent);
  EXPECT_EQ(Node->SelectedIndex, SprigImageComponent);
  EXPECT_EQ(Node->StateIndex, 0);
  EXPECT_EQ(ButtonSprig->TreeNodeFor(nullptr), Node);

  Button->SetName(Long79 + "y");
  ButtonSprig->VisualRefresh();
  EXPECT_EQ(Node->Text, Long79.substr(0, 76) + "... ");
  EXPECT_EQ(ButtonSprig->NodeCaption().size(), 80u);
  EXPECT_EQ(ClipSprigCaption(String(79, 'a')), String(79, 'a'));

  // The widget frees a node: its sprig, and the sprigs of the nodes below, forget theirs.
  TTreeNode* PanelNode = Root->Find(Panel)->TreeNode();
  PanelNode->SetExpanded(true);
  Root->TreeNode()->SetExpanded(true);
  Editor->View->DeleteNode(PanelNode);
  EXPECT_EQ(Root->Find(Panel)->TreeNode(), nullptr);
  EXPECT_EQ(ButtonSprig->TreeNode(), nullptr);

  // Moving a sprig drops its node; the disconnection stores what was expanded and
  // frees the nodes; the editor hears of it last.
  Editor->Populate(Root->Find(Panel), Root->TreeNode());
  Root->Find(Panel)->TreeNode()->SetExpanded(true);
  Root->Add(ButtonSprig);
  EXPECT_EQ(ButtonSprig->TreeNode(), nullptr);
  Root->SetSprigDesigner(nullptr);
  EXPECT_TRUE(Root->Find(Panel)->Expanded());
  EXPECT_TRUE(Root->Expanded());
  EXPECT_EQ(Root->TreeNode(), nullptr);
  EXPECT_EQ(Editor->View->TopCount(), 0);
  EXPECT_EQ(Editor->Shown, std::vector<TRootSprig*>{nullptr});
  EXPECT_EQ(Root->TreeView(), nullptr);
  // Expanding a sprig expands the ones above it.
  Root->SetExpanded(false);
  ButtonSprig->SetExpanded(true);
  EXPECT_TRUE(Root->Expanded());
}

TEST_F(SprigCoreTest, AParentPropertyPlacesTheSprigAndRulesItsDragsAndTheNewComponentsOfItsClass) {
  RegisterSprigType(TLabel::StaticClass(), TFocusLabelSprig::StaticClass());
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1);
  auto* Free = Add<TLabel>(Form1);
  auto* Focused = Add<TLabel>(Form1);
  Focused->SetFocusControl(Panel);
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n    Label2\n  Button1\n  Label1\n");
  TRootSprig* Root = RootOf(Form1);
  TSprig* PanelSprig = Root->Find(Panel);
  TSprig* ButtonSprig = Root->Find(Button);
  TSprig* FreeSprig = Root->Find(Free);
  TSprig* FocusedSprig = Root->Find(Focused);

  // Without the object its property names, a sprig shows a problem.
  EXPECT_TRUE(FreeSprig->AnyProblems());
  EXPECT_EQ(FreeSprig->GetStateIndex(), 1);
  EXPECT_FALSE(FocusedSprig->AnyProblems());
  EXPECT_FALSE(ButtonSprig->AnyProblems());

  // It may be dragged onto the root or onto what the property's class allows.
  EXPECT_TRUE(PanelSprig->DragOver(FreeSprig));
  EXPECT_TRUE(ButtonSprig->DragOver(FreeSprig));
  EXPECT_TRUE(Root->DragOver(FreeSprig));
  EXPECT_FALSE(FocusedSprig->DragOver(FreeSprig)) << "a label focuses no label";
  EXPECT_FALSE(PanelSprig->DragOver(ButtonSprig)) << "no parent property";
  EXPECT_FALSE(PanelSprig->DragOver(nullptr));
  EXPECT_FALSE(PanelSprig->DragDrop(nullptr));
  EXPECT_FALSE(PanelSprig->DragDrop(ButtonSprig));

  EXPECT_TRUE(PanelSprig->DragDrop(FreeSprig));
  EXPECT_EQ(Free->FocusControl(), Panel);
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(RootOf(Form1)->Find(Free)->Parent(), PanelSprig);
  EXPECT_FALSE(PanelSprig->DragDrop(FreeSprig)) << "already there";
  EXPECT_TRUE(Root->DragDrop(FreeSprig));
  EXPECT_EQ(Free->FocusControl(), nullptr);

  // A new component of the class may go where its sprigs may be dragged.
  EXPECT_TRUE(PanelSprig->PaletteOver(TFocusLabelSprig::StaticClass(), TLabel::StaticClass()));
  EXPECT_FALSE(FocusedSprig->PaletteOver(TFocusLabelSprig::StaticClass(), TLabel::StaticClass()));
  EXPECT_FALSE(PanelSprig->PaletteOver(TFocusLabelSprig::StaticClass(), TButton::StaticClass()));
  EXPECT_FALSE(PanelSprig->PaletteOver(TComponentSprig::StaticClass(), TLabel::StaticClass()));
  EXPECT_FALSE(PanelSprig->PaletteOver(nullptr, TLabel::StaticClass()));

  // Components made through a sprig are made by the designer, in the module.
  TComponent* Made = PanelSprig->Construct(TButton::StaticClass());
  ASSERT_NE(Made, nullptr);
  EXPECT_EQ(Made->Owner(), Form1->GetRoot());
  TSprig* Loose = Root->Add(NewSprig(TAbstractSprig::StaticClass(), nullptr).Release());
  TComponent* AtRoot = Loose->Construct(TButton::StaticClass());
  ASSERT_NE(AtRoot, nullptr);
  EXPECT_EQ(static_cast<TButton*>(AtRoot)->Parent(), Form1->GetRoot());
  EXPECT_NE(RootOf(Form1)->Find(Made), nullptr);
  // Without a designer nothing is made.
  TObjectGuard<TSprig> Detached = NewSprig(TComponentSprig::StaticClass(), Panel);
  EXPECT_EQ(Detached->Construct(TButton::StaticClass()), nullptr);
  IPtr<IDesigner> None;
  EXPECT_FALSE(Detached->GetDesigner(None));
  EXPECT_FALSE(Detached->Hidden()) << "asks no designer it does not have";
}

TEST_F(SprigCoreTest, ClassIconsAreLookedUpOnceAClassOnlyWhenTheHostOffersItsViewAndPalette) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  Add<TButton>(Form1);
  Add<TButton>(Form1);
  RootOf(Form1);
  EXPECT_EQ(SprigIconCacheSize(), 0) << "no host services: every sprig keeps the image of its kind";
  IPtr<TStructureViewHost> View = OfferView();
  Add<TLabel>(Form1);
  RootOf(Form1);
  EXPECT_EQ(SprigIconCacheSize(), 0) << "a view without a palette";
  View->Palette = InterfaceOf<IOTAPaletteServices>(New<TRecordingPalette>(&Log).Get());
  Add<TLabel>(Form1);
  Add<TPanel>(Form1);
  TRootSprig* Root = RootOf(Form1);
  EXPECT_EQ(SprigIconCacheSize(), 2) << "TLabel and TPanel, once each";
  EXPECT_EQ(Root->Find(Form1->GetRoot()->FindComponent("Panel1"))->GetIconIndex(), 0);
  EXPECT_EQ(Root->Find(Form1->GetRoot()->FindComponent("Panel1"))->GetImageIndex(), SprigImageComponent);
}

} // namespace
} // namespace formkit::fakes
