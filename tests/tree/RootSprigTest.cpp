//===- tests/tree/RootSprigTest.cpp - The root towards the host's view ---===//
//
// The update bracket that announces a changed structure to the host's view
// only when the view shows this tree, and gives the view back the designer's
// selection; the operations that apply to the one sprig selected in the view;
// the survey of a selection's delete styles, and the edit actions and states
// that follow from it.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnComCtrls.h"
#include "platform/TypInfoBuilder.h"
#include "tests/fakes/FakeRoot.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

/// A sprig whose deletion is its own affair: it records the call and answers `Answer`.
class TOwnDeleteSprig : public TComponentSprig {
  FK_CLASS(TOwnDeleteSprig, TComponentSprig)
  TSprigDeleteStyle DeleteStyle() override { return Style; }
  bool CustomDelete() override {
    ++Calls;
    if (InvalidateOnDelete) Invalidate();
    return Answer;
  }
  TSprigDeleteStyle Style = dsCustom;
  bool Answer = true;
  bool InvalidateOnDelete = false;
  int Calls = 0;
};
FK_IMPLEMENT(TOwnDeleteSprig, "RootSprigTest") {}

/// A designer with edit commands: every action is recorded and answered true.
class TEditingRoot : public TFakeRoot, public IEditHandler {
  FK_CLASS(TEditingRoot, TFakeRoot)
  FK_INTERFACES(IEditHandler)
  using TFakeRoot::TFakeRoot;
  bool EditAction(TEditAction Action) override {
    Record("EditAction(" + GetEnumName(FK_TypeInfo(static_cast<const TEditAction*>(nullptr)), Action) + ")");
    return true;
  }
  TEditState GetEditState() override { return State; }
  void DeleteSelection(bool ADoAll) override { Record(ADoAll ? "DeleteSelection(True)" : "DeleteSelection(False)"); }
  TEditState State{esCanCut, esCanCopy, esCanPaste, esCanDelete, esCanEditOle, esCanCreateTemplate, esCanUndo};
};
FK_IMPLEMENT(TEditingRoot, "RootSprigTest") {}

struct RootSprigTest : TreeFixture {
  /// A tree over a module of the editing designer: the root and three component sprigs,
  /// the last two of which delete themselves.
  void MakeEditingTree() {
    Editing = New<TEditingRoot>("Module1", &Log);
    TComponent* Module = Editing->RootComponent();
    for (const char* Name : {"Normal1", "Own1", "Own2"}) CreateComponentOf<TComponent>(Module)->ChangeName(Name);
    Tree.Reset(static_cast<TRootSprig*>(NewSprig(TRootSprig::StaticClass(), Module).Release()));
    Tree->SetDesigner(InterfaceOf<IDesigner>(Editing.Get()));
    Tree->Add(NewSprig(TComponentSprig::StaticClass(), Module->Components(0)).Release());
    for (int I = 1; I <= 2; ++I) Tree->Add(NewSprig(TOwnDeleteSprig::StaticClass(), Module->Components(I)).Release());
  }
  TOwnDeleteSprig* Own(int I) { return static_cast<TOwnDeleteSprig*>(Tree->Items(I)); }
  void SelectInView(std::initializer_list<TSprig*> Sprigs) {
    View->Selected.clear();
    for (TSprig* S : Sprigs) View->Selected.push_back(S == Tree.Get() ? RootNode : NodeFor(S, RootNode));
  }
  void TearDown() override {
    View = nullptr;
    Tree.Reset();
    Editing = nullptr;
    TreeFixture::TearDown();
  }

  IPtr<TStructureViewHost> View;
  IPtr<TEditingRoot> Editing;
  TObjectGuard<TRootSprig> Tree;
  IPtr<IOTAStructureNode> RootNode;
};

TEST_F(RootSprigTest, TheBracketAnnouncesAChangeOnlyToTheViewShowingThisTreeAndRestoresItsSelection) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Button = Add<TButton>(Form1);
  TRootSprig* Root = RootOf(Form1);
  IPtr<IOTAStructureNode> ButtonNode = NodeFor(Root->Find(Button));

  // Outside a bracket nothing is owed; an end without a beginning stays at 0.
  Root->EnsureUpdate();
  EXPECT_FALSE(Root->NeedUpdate());
  Root->EndUpdate();
  EXPECT_EQ(Root->UpdateLocks(), 0);

  // Without a view, or while the view shows another context, the update stays owed.
  Root->BeginUpdate();
  Root->EnsureUpdate();
  Root->EndUpdate();
  EXPECT_TRUE(Root->NeedUpdate());
  View = OfferView();
  IPtr<IOTAStructureContext> Mine = InterfaceOf<IOTAStructureContext>(New<TViewContext>().Get());
  Root->SetStructureContext(Mine);
  View->Context = InterfaceOf<IOTAStructureContext>(New<TViewContext>().Get());
  Root->BeginUpdate();
  Root->BeginUpdate();
  Root->EnsureUpdate();
  Root->EndUpdate();
  Root->EndUpdate();
  EXPECT_TRUE(Root->NeedUpdate());
  EXPECT_EQ(Log.Count("View.StructureChanged(False)"), 0);

  // The next end that reaches 0 while the view shows this tree announces the change, and
  // the view gets the designer's selection back.
  View->Context = Mine;
  Root->SelectItems({Button}, false);
  Root->BeginUpdate();
  Root->EndUpdate();
  EXPECT_FALSE(Root->NeedUpdate());
  EXPECT_EQ(Log.Count("View.StructureChanged(False)"), 1);
  EXPECT_EQ(Log.Count("View.SelectNode"), 1);
  ASSERT_EQ(View->Selected.size(), 1u);
  EXPECT_EQ(View->Selected[0].Get(), ButtonNode.Get());

  // The list tells the view's bridge of a change only outside a bracket, and only for a
  // tree the view has a context of.
  int Told = 0;
  RootSprigList()->OnStructureChanged = [&](TRootSprig* R, const IPtr<IDesigner>&) { Told += R == Root; };
  Add<TButton>(Form1); // inserted, then modified
  EXPECT_EQ(Told, 2);
  Root->BeginUpdate();
  Add<TButton>(Form1);
  EXPECT_EQ(Told, 2);
  Root->EndUpdate();
  Root->SetStructureContext(nullptr);
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(Told, 2);
  RootSprigList()->OnStructureChanged = nullptr;
}

TEST_F(RootSprigTest, OperationsOnTheSelectionApplyToTheOneSelectedSprigThatIsNotTheRoot) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Bar = Add<TStatusBar>(Form1);
  TRootSprig* Root = RootOf(Form1);
  TSprig* Panels = Root->Find(Bar->Panels());
  ASSERT_NE(Panels, nullptr);
  TSprig* Selected = nullptr;
  EXPECT_FALSE(Root->SelectedSprig(Selected)) << "no view";
  EXPECT_FALSE(Root->CanAdd());

  View = OfferView();
  IPtr<IOTAStructureNode> RootNode = NodeFor(Root);
  IPtr<IOTAStructureNode> PanelsNode = NodeFor(Panels, RootNode);
  View->Selected = {RootNode};
  EXPECT_FALSE(Root->SelectedSprig(Selected)) << "the root's own node";
  EXPECT_FALSE(Root->CanAdd());
  EXPECT_EQ(Root->AddTypeCount(), 0);
  EXPECT_EQ(Root->GetAddType(0), "");
  View->Selected = {PanelsNode, RootNode};
  EXPECT_FALSE(Root->SelectedSprig(Selected)) << "two nodes";

  View->Selected = {PanelsNode};
  ASSERT_TRUE(Root->SelectedSprig(Selected));
  EXPECT_EQ(Selected, Panels);
  EXPECT_TRUE(Root->CanAdd());
  EXPECT_EQ(Root->AddTypeCount(), 1);
  EXPECT_EQ(Root->GetAddType(0), "Add item");
  Root->AddType(0);
  EXPECT_EQ(Bar->Panels()->Count(), 1);
  EXPECT_FALSE(Root->CanMove(true)) << "a collection node does not move";
}

TEST_F(RootSprigTest, TheSurveyOfTheSelectionDecidesWhatMayBeDeletedCutAndCopied) {
  MakeEditingTree();
  View = OfferView();
  RootNode = NodeFor(Tree.Get());
  TSprig* Normal = Tree->Items(0);
  TSprigDeleteStyle Style = dsIgnore;
  bool AllVisible = false;

  // Nothing selected: normal, visible.
  Tree->SelectionSurvey(Style, AllVisible);
  EXPECT_EQ(Style, dsNormal);
  EXPECT_TRUE(AllVisible);
  // Only ignored sprigs: normal.
  Own(1)->Style = dsIgnore;
  SelectInView({Own(1)});
  Tree->SelectionSurvey(Style, AllVisible);
  EXPECT_EQ(Style, dsNormal);
  // A normal and a custom sprig: abort, and no deletion is offered.
  Own(1)->Style = dsCustom;
  SelectInView({Normal, Own(1)});
  Tree->SelectionSurvey(Style, AllVisible);
  EXPECT_EQ(Style, dsAbort);
  EXPECT_EQ(Tree->GetEditState(), (TEditState{esCanCut, esCanCopy, esCanPaste, esCanUndo}));
  EXPECT_FALSE(Tree->EditAction(eaDelete));
  // The root's node aborts too.
  SelectInView({Tree.Get()});
  Tree->SelectionSurvey(Style, AllVisible);
  EXPECT_EQ(Style, dsAbort);

  // Normal sprigs: the designer deletes its selection; cut and copy go to the handler.
  SelectInView({Normal});
  EXPECT_EQ(Tree->GetEditState(), (TEditState{esCanCut, esCanCopy, esCanPaste, esCanDelete, esCanUndo}));
  EXPECT_TRUE(Tree->EditAction(eaDelete));
  EXPECT_EQ(Log.Count("Module1.DeleteSelection(True)"), 1);
  EXPECT_TRUE(Tree->EditAction(eaCopy));
  EXPECT_EQ(Log.Count("Module1.EditAction(eaCopy)"), 1);
  EXPECT_TRUE(Tree->EditAction(eaUndo));
  EXPECT_EQ(Log.Count("Module1.EditAction(eaUndo)"), 1);

  // Custom sprigs delete themselves; the last one still valid is selected after.
  SelectInView({Own(1), Own(2)});
  EXPECT_FALSE(Tree->EditAction(eaCut)) << "only normal sprigs are cut";
  Own(2)->InvalidateOnDelete = true;
  TPersistent* First = Own(1)->Item();
  EXPECT_TRUE(Tree->EditAction(eaDelete));
  EXPECT_EQ(Own(1)->Calls, 1);
  EXPECT_EQ(Own(2)->Calls, 1);
  EXPECT_EQ(Editing->Selected, std::vector<TPersistent*>{First});
  EXPECT_EQ(Log.Count("Module1.Modified"), 1);
  // None of them deleted anything: the action fails and nothing is selected or changed.
  Own(1)->Answer = false;
  SelectInView({Own(1)});
  EXPECT_FALSE(Tree->EditAction(eaDelete));
  EXPECT_EQ(Log.Count("Module1.Modified"), 1);
  // Only invalid sprigs deleted: the module is marked changed instead.
  Own(1)->Answer = true;
  Own(1)->InvalidateOnDelete = true;
  EXPECT_TRUE(Tree->EditAction(eaDelete));
  EXPECT_EQ(Log.Count("Module1.Modified"), 2);

  // A persistent that is no component is hidden: the selection is not cut, copied or
  // pasted then.
  Editing->State = {esCanCut, esCanCopy, esCanPaste, esCanDelete};
  TObjectGuard<TCollection> Loose(new TCollection(TCollectionItem::StaticClass()));
  TSprig* LooseSprig = Tree->Add(NewSprig(TPersistentSprig::StaticClass(), Loose.Get()).Release());
  SelectInView({Normal, LooseSprig});
  EXPECT_EQ(Tree->GetEditState(), TEditState{esCanDelete});
  EXPECT_FALSE(Tree->EditAction(eaCopy));
  LooseSprig->Destroy();
}

TEST_F(RootSprigTest, WithoutAnEditHandlerThereAreNoEditActions) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  TRootSprig* Root = RootOf(Form1);
  EXPECT_FALSE(Root->EditAction(eaDelete));
  EXPECT_FALSE(Root->EditAction(eaUndo));
  EXPECT_EQ(Root->GetEditState(), TEditState{});
  EXPECT_EQ(Root->DeleteStyle(), dsAbort);
  EXPECT_TRUE(Root->PaletteOver(nullptr, nullptr));
}

} // namespace
} // namespace formkit::fakes
