//===- tests/tree/StructureViewTest.cpp - The tree behind the host's view ===//
//
// A module's context in a recording host view: selections travel both ways
// without an echo, an empty view selection waits for the idle moment, only the
// shown context follows the designer, the toolbar and the delete key answer by
// their table, and a context whose root is gone answers empty.
//
//===----------------------------------------------------------------------===//
#include "tests/fakes/FakeRoot.h"
#include "tests/tree/TreeFixture.h"
#include "tree/StructureView.h"

#include <map>

namespace formkit::fakes {
namespace {

/// A data object that keeps streams by format entry; it takes only stream entries of the
/// content aspect.
class TDragData : public TInterfacedObject, public IOTADataObject {
  FK_CLASS(TDragData, TInterfacedObject)
  FK_INTERFACES(IOTADataObject)
  bool QueryGetData(const TOTAFormatEtc& F) override { return Entries.contains(F.Format); }
  IPtr<IStream> GetData(const TOTAFormatEtc& F) override {
    auto It = Entries.find(F.Format);
    return It == Entries.end() ? nullptr : It->second;
  }
  bool SetData(const TOTAFormatEtc& F, const IPtr<IStream>& Medium, bool Release) override {
    if (F.Aspect != OTAAspectContent || F.Medium != OTAMediumStream || !Release) return false;
    Entries[F.Format] = Medium;
    return true;
  }
  std::map<String, IPtr<IStream>> Entries;
};
FK_IMPLEMENT(TDragData, "StructureViewTest") {}

/// A designer with edit commands that records them; deleting is allowed while `State`
/// says so.
class TDeletingRoot : public TFakeRoot, public IEditHandler {
  FK_CLASS(TDeletingRoot, TFakeRoot)
  FK_INTERFACES(IEditHandler)
  using TFakeRoot::TFakeRoot;
  bool EditAction(TEditAction) override { return true; }
  TEditState GetEditState() override { return State; }
  void DeleteSelection(bool) override { Record("DeleteSelection"); }
  void Edit(TComponent* Component) override { Record("Edit(" + Component->Name() + ")"); }
  TEditState State{esCanDelete};
};
FK_IMPLEMENT(TDeletingRoot, "StructureViewTest") {}

struct StructureViewTest : TreeFixture {
  IPtr<TBridgeView> View;
  IPtr<IRoot> Form1;
  TButton* Button = nullptr;
  TLabel* Label = nullptr;
  IPtr<IOTAStructureContext> Context;

  StructureViewTest() { FrameworkSprigs = true; }
  void SetUp() override {
    TreeFixture::SetUp();
    InstallStructureViewBridge();
    View = New<TBridgeView>(&Log);
    HalvernIDEServices = InterfaceOf<IHalvernIDEServices>(View.Get());
    Form1 = NewForm("Form1");
    auto* Panel = Add<TPanel>(Form1);
    Button = Add<TButton>(Form1, Panel);
    Label = Add<TLabel>(Form1);
    Context = StructureContextFor(RootOf(Form1));
    View->Context = Context;
    Log.Clear();
  }
  void TearDown() override {
    Context = nullptr;
    View = nullptr;
    TreeFixture::TearDown();
  }
  TRootSprigStructureContext* Ctx() const { return dynamic_cast<TRootSprigStructureContext*>(Context.Get()); }
  IPtr<IOTAStructureContext110> Ctx110() const { return QueryAs<IOTAStructureContext110>(Context); }
  IPtr<IOTAStructureNode> NodeOf(TPersistent* Item) { return StructureNodeFor(RootOf(Form1)->Find(Item)); }
  /// The view selects the nodes of `Items` and says so.
  void SelectInView(std::initializer_list<TPersistent*> Items) {
    View->Selected.clear();
    for (TPersistent* Item : Items) View->Selected.push_back(NodeOf(Item));
    Ctx110()->NodeSelected(View->Selected.empty() ? nullptr : View->Selected.front());
  }
  std::vector<TPersistent*> DesignerSelection() {
    IPtr<TDesignerSelections> List = New<TDesignerSelections>();
    DesignerOf(Form1)->GetSelections(InterfaceOf<IDesignerSelections>(List.Get()));
    std::vector<TPersistent*> Items;
    for (int I = 0; I < List->GetCount(); ++I) Items.push_back(List->Get(I));
    return Items;
  }
  void SelectInDesigner(std::initializer_list<TPersistent*> Items) {
    IPtr<TDesignerSelections> List = New<TDesignerSelections>();
    for (TPersistent* Item : Items) List->Add(Item);
    DesignerOf(Form1)->SetSelections(InterfaceOf<IDesignerSelections>(List.Get()));
  }
  std::vector<TSprig*> ViewSprigs() {
    std::vector<TSprig*> Sprigs;
    for (const auto& Node : View->Selected) Sprigs.push_back(QueryAs<ISprig>(Node)->GetSprig());
    return Sprigs;
  }
};

TEST_F(StructureViewTest, NodesLeadToTheirSprigsAndUpToTheContext) {
  TRootSprig* Root = RootOf(Form1);
  IPtr<IOTAStructureNode> ButtonNode = NodeOf(Button);
  ASSERT_TRUE(ButtonNode);
  EXPECT_EQ(NodeOf(Button).Get(), ButtonNode.Get()) << "one adapter a sprig";
  EXPECT_EQ(QueryAs<ISprig>(ButtonNode)->GetSprig(), Root->Find(Button));
  IPtr<IOTAStructureNode> PanelNode = ButtonNode->GetParent();
  EXPECT_EQ(QueryAs<ISprig>(PanelNode)->GetSprig(), Root->Find(Button)->Parent());
  IPtr<IOTAStructureNode> RootNode = PanelNode->GetParent();
  EXPECT_EQ(RootNode.Get(), StructureNodeFor(Root).Get());
  IPtr<IOTAStructureNode> Top = RootNode->GetParent();
  EXPECT_TRUE(SameObject<IOTAStructureContext>(QueryAs<IOTAStructureContext>(Top).Get(), Context.Get()));
  EXPECT_EQ(Top->GetParent(), nullptr);
  EXPECT_EQ(StructureNodeFor(nullptr), nullptr);

  EXPECT_EQ(Ctx110()->GetContextIdent(), "Form1");
  EXPECT_EQ(Ctx110()->GetStructureType(), "Designer.StructureType");
  EXPECT_EQ(Ctx110()->GetViewOptions(), 2);
  EXPECT_EQ(Ctx110()->GetRootNodeCount(), 1);
  EXPECT_EQ(Ctx110()->SameContext(Context), OTATrue);
  EXPECT_EQ(Ctx110()->SameContext(nullptr), OTAFalse);
  EXPECT_EQ(StructureContextFor(Root).Get(), Context.Get()) << "one context a tree";
  EXPECT_EQ(QueryAs<IOTAStructureNodeStatePreserver>(Context)->GetNodePreservationMode(), onpIntegrated);

  // What the view reads of a node comes from its sprig.
  auto ButtonReads = QueryAs<IOTAStructureNode110>(ButtonNode);
  auto PanelReads = QueryAs<IOTAStructureNode110>(PanelNode);
  ASSERT_TRUE(ButtonReads);
  EXPECT_EQ(ButtonReads->GetCaption(), "Button1");
  EXPECT_EQ(ButtonReads->GetEditCaption(), "Button1");
  EXPECT_EQ(ButtonReads->GetName(), "Button1");
  EXPECT_EQ(ButtonReads->GetHint(), "");
  EXPECT_EQ(ButtonReads->GetChildCount(), 0);
  EXPECT_EQ(PanelReads->GetChildCount(), 1);
  EXPECT_EQ(PanelReads->GetChild(0).Get(), ButtonNode.Get());
  EXPECT_EQ(PanelReads->GetChild(1), nullptr);
  EXPECT_EQ(PanelReads->GetChild(-1), nullptr);
  EXPECT_EQ(ButtonReads->AddChildNode(PanelNode, 0), -1);
  ButtonReads->RemoveChildNode(0);
  EXPECT_EQ(PanelReads->GetChildCount(), 1) << "the sprigs own the tree";
  EXPECT_EQ(ButtonReads->GetImageIndex(), -1) << "no image offset yet";
  GImageOffset = 100;
  EXPECT_EQ(ButtonReads->GetImageIndex(), 107);
  EXPECT_EQ(PanelReads->GetImageIndex(), 108);
  GImageOffset = -1;
  EXPECT_EQ(ButtonReads->GetStateIndex(), -1) << "no state";
  ButtonReads->SetData(42);
  EXPECT_EQ(ButtonReads->GetData(), 42);
  ButtonReads->SetSelected(OTATrue);
  ButtonReads->SetFocused(OTATrue);
  EXPECT_EQ(ButtonReads->GetSelected(), OTATrue);
  EXPECT_EQ(ButtonReads->GetFocused(), OTATrue);
  EXPECT_EQ(PanelReads->GetSelected(), OTAFalse);
  Root->SetExpanded(false);
  ButtonReads->SetExpanded(OTATrue);
  EXPECT_TRUE(Root->Find(Button)->Expanded());
  EXPECT_EQ(PanelReads->GetExpanded(), OTATrue) << "expanding a sprig expands its parents";
  auto Sorted = QueryAs<IOTASortableStructureNode>(ButtonNode);
  EXPECT_EQ(Sorted->GetSortByIndex(), OTAFalse);
  EXPECT_EQ(Sorted->GetItemIndex(), 0);
  auto ContextReads = QueryAs<IOTAStructureNode110>(Context);
  EXPECT_EQ(ContextReads->GetChildCount(), 1);
  EXPECT_EQ(ContextReads->GetChild(0).Get(), RootNode.Get());
  EXPECT_EQ(ContextReads->GetChild(1), nullptr);

  // A sprig that goes leaves a node the host may still hold, answering empty.
  Label->Destroy();
  Label = nullptr;
  IPtr<IOTAStructureNode> Held = ButtonNode;
  Button->Destroy();
  Button = nullptr;
  RootOf(Form1);
  EXPECT_EQ(QueryAs<ISprig>(Held)->GetSprig(), nullptr);
  EXPECT_EQ(Held->GetParent(), nullptr);
  GImageOffset = 100;
  EXPECT_EQ(ButtonReads->GetImageIndex(), -1);
  GImageOffset = -1;
  EXPECT_EQ(ButtonReads->GetCaption(), "");
  EXPECT_EQ(ButtonReads->GetName(), "");
  EXPECT_EQ(ButtonReads->GetChildCount(), 0);
  EXPECT_EQ(ButtonReads->GetChild(0), nullptr);
  EXPECT_EQ(ButtonReads->GetExpanded(), OTAFalse);
  EXPECT_EQ(ButtonReads->GetStateIndex(), -1);
  EXPECT_EQ(Sorted->GetItemIndex(), -1);
  EXPECT_EQ(ButtonReads->GetData(), 42) << "the host's value stays";
}

TEST_F(StructureViewTest, AViewSelectionReachesTheDesignerOnceWithNoEchoAndNoReorder) {
  SelectInView({Button});
  EXPECT_EQ(DesignerSelection(), std::vector<TPersistent*>{Button});
  EXPECT_EQ(Log.Count("View.SelectNode"), 0) << "the designer's answer did not come back";
  EXPECT_EQ(Log.Count("View.ClearSelection"), 0);
  EXPECT_EQ(ViewSprigs().size(), 1u);

  SelectInView({Button, Label});
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Button, Label}));
  // The same items in another order are the same selection: the anchor stays.
  SelectInView({Label, Button});
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Button, Label}));
  // A busy view is not listened to.
  View->Busy = true;
  SelectInView({Label});
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Button, Label}));
  View->Busy = false;
  // Nodes without sprigs carry nothing; the root's node carries the form.
  SelectInView({Form1->GetRoot()});
  EXPECT_EQ(DesignerSelection(), std::vector<TPersistent*>{Form1->GetRoot()});
  EXPECT_EQ(Log.Count("View.SelectNode"), 0);
}

TEST_F(StructureViewTest, AnEmptyViewSelectionWaitsForTheIdleMoment) {
  SelectInView({Label});
  SelectInView({});
  EXPECT_TRUE(Ctx()->PendingClearSelection());
  EXPECT_EQ(DesignerSelection(), std::vector<TPersistent*>{Label}) << "not yet";
  SelectInView({Label});
  EXPECT_FALSE(Ctx()->PendingClearSelection());
  Ctx()->Idle();
  EXPECT_EQ(DesignerSelection(), std::vector<TPersistent*>{Label}) << "refilled before idle: left alone";

  SelectInView({});
  View->Busy = true;
  Ctx()->Idle();
  EXPECT_FALSE(Ctx()->PendingClearSelection()) << "the idle moment passed";
  EXPECT_EQ(DesignerSelection(), std::vector<TPersistent*>{Label}) << "a busy view clears nothing";
  View->Busy = false;
  SelectInView({});
  Ctx()->Idle();
  EXPECT_TRUE(DesignerSelection().empty());
  Ctx()->Idle();
  EXPECT_TRUE(DesignerSelection().empty());
}

TEST_F(StructureViewTest, TheShownContextFollowsTheDesignerAndAnotherCatchesUpWhenActivated) {
  SelectInDesigner({Label, Button});
  EXPECT_EQ(Log.Count("View.ClearSelection"), 1);
  EXPECT_EQ(ViewSprigs(), (std::vector<TSprig*>{RootOf(Form1)->Find(Label), RootOf(Form1)->Find(Button)}));
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Label, Button})) << "no echo to the designer";

  // Another module's context is shown: this one leaves the view alone.
  IPtr<IRoot> Form2 = NewForm("Form2");
  View->Context = StructureContextFor(RootOf(Form2));
  Log.Clear();
  SelectInDesigner({Button});
  EXPECT_EQ(Log.Count("View.ClearSelection"), 0);
  EXPECT_EQ(Log.Count("View.SelectNode"), 0);
  View->Context = Context;
  Ctx110()->ContextActivated();
  EXPECT_EQ(ViewSprigs(), std::vector<TSprig*>{RootOf(Form1)->Find(Button)});
  // A change of the module makes the view read the tree again, deferred.
  Log.Clear();
  DesignerOf(Form1)->Modified();
  EXPECT_EQ(Log.Count("View.StructureChanged(True)"), 1);
  DesignerOf(Form2)->Modified();
  EXPECT_EQ(Log.Count("View.StructureChanged(True)"), 2) << "each context hears its own designer";
}

TEST_F(StructureViewTest, TheToolbarAndTheDeleteKeyAnswerByTheTable) {
  auto Bar = QueryAs<IOTAStructureContextToolbar>(Context);
  ASSERT_TRUE(Bar);
  EXPECT_EQ(Bar->GetButtonCount(), 5);
  const char* Captions[] = {"Add", "Delete", "", "Up", "Down"};
  const char* Hints[] = {"New Item", "Delete", "", "Move Up", "Move Down"};
  for (int I = 0; I < 5; ++I) {
    EXPECT_EQ(Bar->GetButtonCaption(I), Captions[I]);
    EXPECT_EQ(Bar->GetButtonHint(I), Hints[I]);
    EXPECT_EQ(Bar->GetButtonSeparator(I), ToOTABool(I == 2));
    EXPECT_EQ(Bar->GetButtonVisible(I), OTATrue);
    EXPECT_EQ(Bar->GetButtonImageIndex(I), -1) << "no offset yet";
  }
  EXPECT_EQ(Bar->GetButtonCaption(5), "");
  GToolButtonImageOffset = 20;
  EXPECT_EQ(Bar->GetButtonImageIndex(0), 24);
  EXPECT_EQ(Bar->GetButtonImageIndex(1), 25);
  EXPECT_EQ(Bar->GetButtonImageIndex(2), 26);
  EXPECT_EQ(Bar->GetButtonImageIndex(3), 26) << "shares the separator's number";
  EXPECT_EQ(Bar->GetButtonImageIndex(4), 27);
  EXPECT_EQ(Bar->GetButtonImageIndex(5), -1);
  GToolButtonImageOffset = -1;
  EXPECT_EQ(Bar->GetButtonEnabled(2), OTAFalse);
  EXPECT_EQ(Bar->GetButtonHasDropDown(0), OTAFalse) << "a form has nothing to add";
  EXPECT_EQ(Bar->GetButtonEnabled(0), OTAFalse);
  Bar->Invoke(0);
  EXPECT_EQ(Log.Text(), "View.BeginUpdate\nView.EndUpdate\n");

  // Without an edit handler nothing may be deleted, and the key stays with the view.
  SelectInView({Label});
  EXPECT_EQ(QueryAs<IOTAStructureContextEditActions>(Context)->GetEditState(), TEditState{});
  EXPECT_EQ(Bar->GetButtonEnabled(1), OTAFalse);
  std::uint16_t Key = 46;
  QueryAs<IOTAStructureContextKeyHandler>(Context)->KeyDown(View->Selected.front(), 0, Key);
  EXPECT_EQ(Key, 46);
  EXPECT_NE(Form1->GetRoot()->FindComponent("Label1"), nullptr);
}

TEST_F(StructureViewTest, TheDeleteKeyDeletesOnlyWhenAllowedAndUnmodified) {
  IPtr<TDeletingRoot> Editing = New<TDeletingRoot>("Module1", &Log);
  TComponent* Module = Editing->RootComponent();
  CreateComponentOf<TComponent>(Module)->ChangeName("Thing1");
  TObjectGuard<TRootSprig> Tree(static_cast<TRootSprig*>(NewSprig(TRootSprig::StaticClass(), Module).Release()));
  Tree->SetDesigner(InterfaceOf<IDesigner>(Editing.Get()));
  TSprig* Thing = Tree->Add(NewSprig(TComponentSprig::StaticClass(), Module->Components(0)).Release());
  IPtr<IOTAStructureContext> Own = StructureContextFor(Tree.Get());
  View->Context = Own;
  View->Selected = {StructureNodeFor(Thing)};
  auto Keys = QueryAs<IOTAStructureContextKeyHandler>(Own);
  auto Edits = QueryAs<IOTAStructureContextEditActions>(Own);
  auto Bar = QueryAs<IOTAStructureContextToolbar>(Own);
  EXPECT_EQ(Bar->GetButtonEnabled(1), OTATrue);
  EXPECT_EQ(Edits->GetEditState(), TEditState{esCanDelete});
  Log.Clear();

  std::uint16_t Key = 46;
  for (std::uint16_t Blocking : {4, 8, 12}) {
    Keys->KeyDown(View->Selected.front(), Blocking, Key);
    EXPECT_EQ(Key, 46) << Blocking;
  }
  std::uint16_t Other = 45;
  Keys->KeyDown(View->Selected.front(), 0, Other);
  EXPECT_EQ(Other, 45);
  EXPECT_EQ(Log.Count("Module1.DeleteSelection"), 0);
  Keys->KeyDown(View->Selected.front(), 1 | 2 | 16, Key);
  EXPECT_EQ(Key, 0) << "shift bits outside the mask do not block";
  EXPECT_EQ(Log.Count("Module1.DeleteSelection"), 1);

  // The edit state is remembered until the structure changes.
  Editing->State = {};
  Key = 46;
  Keys->KeyDown(View->Selected.front(), 0, Key);
  EXPECT_EQ(Key, 0) << "the remembered state still allows it";
  EXPECT_EQ(Bar->GetButtonEnabled(1), OTAFalse) << "the button asks the root each time";
  dynamic_cast<TRootSprigStructureContext*>(Own.Get())->StructureChanged(InterfaceOf<IDesigner>(Editing.Get()));
  EXPECT_EQ(Log.Count("View.StructureChanged(True)"), 1);
  EXPECT_EQ(Edits->GetEditState(), TEditState{});
  Key = 46;
  Keys->KeyDown(View->Selected.front(), 0, Key);
  EXPECT_EQ(Key, 46);
  EXPECT_EQ(Log.Count("Module1.DeleteSelection"), 2);
  // The toolbar's delete goes the same way, inside the view's update bracket; a tree that
  // waits for repopulation is read again before the bracket closes.
  Log.Clear();
  ASSERT_TRUE(Tree->RepopulateNeeded());
  Bar->Invoke(1);
  EXPECT_EQ(Log.Text(), "View.BeginUpdate\nModule1.DeleteSelection\nView.StructureChanged(False)\nView.EndUpdate\n");

  // A double click edits the one selected node's component, and only that.
  auto Own110 = QueryAs<IOTAStructureContext110>(Own);
  IPtr<IOTAStructureNode> ThingNode = StructureNodeFor(Thing);
  Log.Clear();
  Own110->DefaultNodeAction(StructureNodeFor(Tree.Get()));
  Own110->DefaultNodeAction(nullptr);
  View->Selected = {ThingNode, StructureNodeFor(Tree.Get())};
  Own110->DefaultNodeAction(ThingNode);
  EXPECT_EQ(Log.Text(), "") << "not the selected node, no node, two selected";
  View->Selected = {ThingNode};
  Own110->DefaultNodeAction(ThingNode);
  EXPECT_EQ(Log.Text(), "Module1.Edit(Thing1)\n");

  View->Selected.clear();
  View->Context = Context;
  Tree.Reset();
  EXPECT_EQ(QueryAs<IOTAStructureContext110>(Own)->GetRootNodeCount(), 0);
}

TEST_F(StructureViewTest, DraggedNodesTravelInTheSprigFormatAndLandOnANode) {
  auto Drag = QueryAs<IOTADragStructureContext>(Context);
  ASSERT_TRUE(Drag);
  auto* Panel = static_cast<TPanel*>(Form1->GetRoot()->FindComponent("Panel1"));
  auto* Inner = Add<TPanel>(Form1, Panel);
  Log.Clear();
  View->Selected = {NodeOf(Label)};
  IPtr<TDragData> Data = New<TDragData>();
  IPtr<IInterface> DataIntf = InterfaceOf<IOTADataObject>(Data.Get());
  int Effect = 0;
  TOTABool Accept = OTATrue;
  EXPECT_EQ(Drag->DragAllowed(nullptr), OTATrue);
  EXPECT_EQ(Drag->GetDataObject(), nullptr);

  // Entering puts the view's selection into the data object under "Halvern.Sprig".
  Drag->DragOver(NodeOf(Panel), DataIntf, odsDragEnter, 0, 0, odmAbove, Effect, Accept);
  EXPECT_EQ(Accept, OTAFalse) << "nothing lands between nodes";
  ASSERT_EQ(Data->Entries.size(), 1u);
  auto Payload = QueryAs<IInternalDragSprigs>(Data->Entries.at("Halvern.Sprig"));
  ASSERT_TRUE(Payload);
  EXPECT_EQ(Payload->Count(), 1);
  EXPECT_EQ(Payload->Sprigs(0), RootOf(Form1)->Find(Label));
  EXPECT_EQ(Payload->Sprigs(1), nullptr);
  // A second enter keeps the payload it finds.
  View->Selected = {NodeOf(Button)};
  Drag->DragOver(NodeOf(Panel), DataIntf, odsDragEnter, 0, 0, odmOnNode, Effect, Accept);
  EXPECT_EQ(Payload->Count(), 1);
  EXPECT_EQ(Accept, OTATrue);
  EXPECT_EQ(Effect, OTADropEffectMove);
  Effect = 0;
  Drag->DragOver(NodeOf(Button), DataIntf, odsDragMove, 0, 0, odmOnNode, Effect, Accept);
  EXPECT_EQ(Accept, OTAFalse) << "a button takes no controls";
  EXPECT_EQ(Effect, 0);
  Drag->DragOver(NodeOf(Panel), DataIntf, odsDragLeave, 0, 0, odmOnNode, Effect, Accept);
  EXPECT_EQ(Accept, OTAFalse);
  Drag->DragOver(NodeOf(Panel), nullptr, odsDragMove, 0, 0, odmOnNode, Effect, Accept);
  EXPECT_EQ(Accept, OTAFalse) << "no data object";
  Drag->DragOver(nullptr, DataIntf, odsDragMove, 0, 0, odmOnNode, Effect, Accept);
  EXPECT_EQ(Accept, OTAFalse) << "no target";

  // A parent onto its own child, or onto itself, is refused.
  IPtr<TDragData> ParentData = New<TDragData>();
  View->Selected = {NodeOf(Panel)};
  Drag->DragOver(NodeOf(Inner), InterfaceOf<IOTADataObject>(ParentData.Get()), odsDragEnter, 0, 0, odmOnNode, Effect,
                 Accept);
  EXPECT_EQ(Accept, OTAFalse);
  Drag->DragOver(NodeOf(Panel), InterfaceOf<IOTADataObject>(ParentData.Get()), odsDragMove, 0, 0, odmOnNode, Effect,
                 Accept);
  EXPECT_EQ(Accept, OTAFalse);

  // The drop moves the label into the panel and selects it.
  Log.Clear();
  Drag->DragDrop(NodeOf(Panel), DataIntf, 0, 0, 0, odmOnNode, Effect);
  EXPECT_EQ(Label->Parent(), Panel);
  EXPECT_EQ(DesignerSelection(), std::vector<TPersistent*>{Label});
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n    Button1\n    Panel2\n    Label1\n");
  EXPECT_EQ(ViewSprigs(), std::vector<TSprig*>{RootOf(Form1)->Find(Label)}) << "the view follows the designer";
  // Without a payload or a target nothing happens.
  Drag->DragDrop(NodeOf(Form1->GetRoot()), InterfaceOf<IOTADataObject>(New<TDragData>().Get()), 0, 0, 0, odmOnNode,
                 Effect);
  Drag->DragDrop(nullptr, DataIntf, 0, 0, 0, odmOnNode, Effect);
  EXPECT_EQ(Label->Parent(), Panel);
  Payload->Remove(RootOf(Form1)->Find(Label));
  EXPECT_EQ(Payload->Count(), 0);
}

TEST_F(StructureViewTest, AfterItsRootIsGoneTheContextAnswersEmpty) {
  IPtr<IOTAStructureNode> RootNode = StructureNodeFor(RootOf(Form1));
  Form1->Close();
  auto Ctx = Ctx110();
  EXPECT_EQ(Ctx->GetRootNodeCount(), 0);
  EXPECT_EQ(QueryAs<IOTAStructureNode110>(Context)->GetChildCount(), 0);
  EXPECT_EQ(QueryAs<IOTAStructureNode110>(Context)->GetChild(0), nullptr);
  EXPECT_EQ(Ctx->GetContextIdent(), "");
  EXPECT_EQ(Ctx->GetRootStructureNode(0), nullptr);
  EXPECT_EQ(RootNode->GetParent(), nullptr);
  EXPECT_EQ(QueryAs<ISprig>(RootNode)->GetSprig(), nullptr);
  auto Bar = QueryAs<IOTAStructureContextToolbar>(Context);
  for (int I = 0; I < 5; ++I) EXPECT_EQ(Bar->GetButtonEnabled(I), OTAFalse);
  EXPECT_EQ(Bar->GetButtonHasDropDown(0), OTAFalse);
  EXPECT_EQ(QueryAs<IOTAStructureContextEditActions>(Context)->EditAction(eaDelete), OTAFalse);
  EXPECT_EQ(QueryAs<IOTAStructureContextEditActions>(Context)->GetEditState(), TEditState{});
  Log.Clear();
  Bar->Invoke(1);
  Ctx->NodeSelected(nullptr);
  Ctx->ContextActivated();
  Ctx->DefaultNodeAction(nullptr);
  std::uint16_t Key = 46;
  QueryAs<IOTAStructureContextKeyHandler>(Context)->KeyDown(nullptr, 0, Key);
  EXPECT_EQ(Key, 46);
  EXPECT_EQ(Log.Text(), "");
}

} // namespace
} // namespace formkit::fakes
