//===- tests/tree/StructureMenuTest.cpp - The view's popup over a node ----===//
//
// The host's menu layer is a small one of the test's own: items with captions,
// tags and sub-items, whose click calls their handler with an object carrying
// the tag. The module's local menu comes from the host through the designer.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/design/StructureMenuItems.h"
#include "tests/tree/TreeFixture.h"
#include "tree/StructureView.h"

namespace formkit::fakes {
namespace {

/// One item of the test's menu layer; a line is captioned "-".
class TLayerItem : public TInterfacedObject, public IMenuItem290 {
  FK_CLASS(TLayerItem, TInterfacedObject)
  FK_INTERFACES(IMenuItem290)
  TLayerItem() : FSender(CreateComponentOf<TComponent>(nullptr)) {}
  explicit TLayerItem(String Caption, TNotifyEvent OnClick = {}, int Tag = 0) : TLayerItem() {
    FCaption = std::move(Caption);
    FOnClick = OnClick;
    FSender->SetTag(Tag);
  }
  void BeforeDestruction() override {
    FreeAndNil(FSender);
    inherited::BeforeDestruction();
  }

  IPtr<IMenuItem> AddItem(TComponent* Action, const String& Name) override {
    IPtr<TLayerItem> Item = New<TLayerItem>(Action ? Action->Name() : Name);
    Item->FAction = Action;
    FItems.push_back(Item);
    return IPtr<IMenuItem>(Item.Get());
  }
  IPtr<IMenuItem> AddLine(const String&) override { return InsertLine(GetCount(), ""); }
  IPtr<IMenuItem> InsertLine(int Index, const String&) override { return Insert(Index, New<TLayerItem>("-")); }
  int GetCount() override { return static_cast<int>(FItems.size()); }
  IPtr<IMenuItem> GetItem(int Index) override { return IPtr<IMenuItem>(FItems.at(static_cast<std::size_t>(Index)).Get()); }
  IPtr<IMenuItem> InsertItem(int Index, const String& Caption, const String&, const TNotifyEvent& OnClick,
                             int Tag) override {
    return Insert(Index, New<TLayerItem>(Caption, OnClick, Tag));
  }
  String GetCaption() override { return FCaption; }
  String GetName() override { return "Item" + FCaption; }
  bool GetChecked() override { return FCaption == "Checked"; }
  bool GetEnabled() override { return true; }
  bool GetVisible() override { return true; }
  bool GetIsLine() override { return FCaption == "-"; }
  TComponent* GetAction() override { return FAction; }
  int GetGroupIndex() override { return 3; }
  bool GetRadioItem() override { return FCaption == "Checked"; }
  int GetShortCut() override { return FCaption == "Checked" ? 16449 : 0; }
  void Click() override {
    if (FOnClick) FOnClick(FSender);
  }

private:
  IPtr<IMenuItem> Insert(int Index, IPtr<TLayerItem> Item) {
    Index = std::clamp(Index, 0, GetCount());
    FItems.insert(FItems.begin() + Index, Item);
    return IPtr<IMenuItem>(Item.Get());
  }
  String FCaption;
  TNotifyEvent FOnClick;
  TComponent* FSender; // owned: what a click hands its handler
  TComponent* FAction = nullptr;
  std::vector<IPtr<TLayerItem>> FItems;
};

class TLayerPopup : public TInterfacedObject, public IPopupMenu {
  FK_CLASS(TLayerPopup, TInterfacedObject)
  FK_INTERFACES(IPopupMenu)
  IPtr<IMenuItem> GetItems() override { return IPtr<IMenuItem>(Items.Get()); }
  IPtr<TLayerItem> Items = New<TLayerItem>("");
};

/// The view's own popup: entries put in by anyone, as captions in order.
class TViewMenu : public TInterfacedObject, public IOTAStructureNodeMenuItem {
  FK_CLASS(TViewMenu, TInterfacedObject)
  FK_INTERFACES(IOTAStructureNodeMenuItem)
  std::vector<IPtr<IOTAStructureNodeMenuItem>> Entries;
  void DeleteItem(int AIndex) override { Entries.erase(Entries.begin() + AIndex); }
  String Get_Caption() override { return ""; }
  TOTABool Get_Checked() override { return OTAFalse; }
  int Get_Count() override { return static_cast<int>(Entries.size()); }
  TOTABool Get_Enabled() override { return OTATrue; }
  int Get_GroupIndex() override { return 0; }
  int Get_ImageIndex() override { return -1; }
  IPtr<IOTAStructureNodeMenuItem> Get_Item(int AIndex) override { return Entries.at(static_cast<std::size_t>(AIndex)); }
  String Get_Name() override { return ""; }
  TOTABool Get_RadioItem() override { return OTAFalse; }
  int Get_ShortCut() override { return 0; }
  TOTABool Get_Visible() override { return OTATrue; }
  void InsertItem(int AIndex, const IPtr<IOTAStructureNodeMenuItem>& AItem) override {
    Entries.insert(Entries.begin() + AIndex, AItem);
  }
  void Invoke() override {}
  std::vector<String> Captions() const {
    std::vector<String> All;
    for (const auto& E : Entries) All.push_back(E->Get_Caption());
    return All;
  }
};

/// Counts the clicks of the items it handles.
class TClickCounter : public TInterfacedObject {
  FK_CLASS(TClickCounter, TInterfacedObject)
  int Count = 0;
  void Clicked(TObject*) { ++Count; }
};

FK_IMPLEMENT(TClickCounter, "StructureMenuTest") {}
FK_IMPLEMENT(TLayerItem, "StructureMenuTest") {}
FK_IMPLEMENT(TLayerPopup, "StructureMenuTest") {}
FK_IMPLEMENT(TViewMenu, "StructureMenuTest") {}

struct StructureMenuTest : TreeFixture {
  IPtr<TBridgeView> View;
  IPtr<IRoot> Form1;
  TStatusBar* Bar = nullptr;
  IPtr<IOTAStructureContext> Context;
  std::vector<TLocalMenuTypes> Asked;

  StructureMenuTest() { FrameworkSprigs = true; }
  void SetUp() override {
    TreeFixture::SetUp();
    InstallStructureViewBridge();
    View = New<TBridgeView>(&Log);
    HalvernIDEServices = InterfaceOf<IHalvernIDEServices>(View.Get());
    Form1 = NewForm("Form1");
    Bar = Add<TStatusBar>(Form1);
    Bar->Panels()->Add()->SetText("A");
    Context = StructureContextFor(RootOf(Form1));
    View->Context = Context;
    Log.Clear();
  }
  void TearDown() override {
    Env->LocalMenu = nullptr;
    Context = nullptr;
    View = nullptr;
    TreeFixture::TearDown();
  }
  /// The host builds each local menu with two entries of its own.
  void OfferLocalMenus() {
    Env->LocalMenu = [this](TLocalMenuTypes Kinds) {
      Asked.push_back(Kinds);
      IPtr<TLayerPopup> Popup = New<TLayerPopup>();
      Popup->Items->InsertItem(0, "Edit", "", {}, 0);
      Popup->Items->InsertItem(1, "Checked", "", {}, 0);
      return IPtr<IPopupMenu>(Popup.Get());
    };
  }
  IPtr<IOTAStructureNode> NodeOf(TPersistent* Item) { return StructureNodeFor(RootOf(Form1)->Find(Item)); }
  IPtr<IOTAStructureContext110> Ctx110() const { return QueryAs<IOTAStructureContext110>(Context); }
};

TEST_F(StructureMenuTest, TheNodesEntriesAndAddTypesGoAboveTheViewsOwn) {
  IPtr<TViewMenu> Menu = New<TViewMenu>();
  Menu->Entries.push_back(NewAs<IOTAStructureNodeMenuItem, TViewMenu>());
  IPtr<IOTAStructureNode> Panels = NodeOf(Bar->Panels());
  // Without the host's menu layer the view's menu stays as it is.
  Ctx110()->InitPopupMenu(Panels, IPtr<IOTAStructureNodeMenuItem>(Menu.Get()));
  EXPECT_EQ(Menu->Get_Count(), 1);

  OfferLocalMenus();
  View->Selected = {Panels};
  Ctx110()->InitPopupMenu(Panels, IPtr<IOTAStructureNodeMenuItem>(Menu.Get()));
  ASSERT_EQ(Asked.size(), 1u);
  EXPECT_EQ(Asked[0], (TLocalMenuTypes{lmModule, lmSelection, lmComponent}));
  // A separator over the node's add types, their separator, the local menu, the view's own.
  EXPECT_EQ(Menu->Captions(), (std::vector<String>{"-", "Add item", "-", "Edit", "Checked", ""}));
  auto* Ctx = dynamic_cast<TRootSprigStructureContext*>(Context.Get());
  ASSERT_TRUE(Ctx->LastPopup());

  // The entries read through to the menu layer.
  IPtr<IOTAStructureNodeMenuItem290> Checked = QueryAs<IOTAStructureNodeMenuItem290>(Menu->Entries[4]);
  ASSERT_TRUE(Checked);
  EXPECT_EQ(Checked->Get_Checked(), OTATrue);
  EXPECT_EQ(Checked->Get_RadioItem(), OTATrue);
  EXPECT_EQ(Checked->Get_ShortCut(), 16449);
  EXPECT_EQ(Checked->Get_GroupIndex(), 3);
  EXPECT_EQ(Checked->Get_ImageIndex(), -1);
  EXPECT_EQ(Checked->Get_Name(), "ItemChecked");
  EXPECT_EQ(Checked->Get_Count(), 0);
  EXPECT_EQ(Checked->Get_Item(0), nullptr);
  EXPECT_EQ(Checked->GetAction(), nullptr);
  Checked->InsertItem(0, nullptr); // the menu layer's entries are not the view's to change
  Checked->DeleteItem(0);

  // Choosing the add type adds an item to the selected collection, inside the view's
  // update bracket.
  Log.Clear();
  Menu->Entries[1]->Invoke();
  EXPECT_EQ(Bar->Panels()->Count(), 2);
  ASSERT_GE(Log.Calls.size(), 2u);
  EXPECT_EQ(Log.Calls.front(), "View.BeginUpdate");
  EXPECT_EQ(Log.Calls.back(), "View.EndUpdate");
}

TEST_F(StructureMenuTest, ANodeWithoutAnItemGetsOnlyTheBaseMenuAndAnEmptyViewMenuNoSeparator) {
  OfferLocalMenus();
  IPtr<TViewMenu> Menu = New<TViewMenu>();
  // The root's node has no add types while nothing is selected, and a view menu without
  // entries gets no separator.
  Ctx110()->InitPopupMenu(NodeOf(Form1->GetRoot()), IPtr<IOTAStructureNodeMenuItem>(Menu.Get()));
  EXPECT_EQ(Menu->Captions(), (std::vector<String>{"Edit", "Checked"}));
  // A node the view made itself, with no sprig behind it, asks for the base entries.
  IPtr<IOTAStructureNode> Bare = NewAs<IOTAStructureNode, TViewNode>(nullptr);
  IPtr<TViewMenu> Other = New<TViewMenu>();
  Ctx110()->InitPopupMenu(Bare, IPtr<IOTAStructureNodeMenuItem>(Other.Get()));
  ASSERT_EQ(Asked.size(), 2u);
  EXPECT_EQ(Asked[1], TLocalMenuTypes{});
  // Without the view nothing is built.
  HalvernIDEServices = nullptr;
  IPtr<TViewMenu> None = New<TViewMenu>();
  Ctx110()->InitPopupMenu(NodeOf(Bar), IPtr<IOTAStructureNodeMenuItem>(None.Get()));
  EXPECT_EQ(None->Get_Count(), 0);
  EXPECT_EQ(Asked.size(), 2u);
}

TEST_F(StructureMenuTest, AViewMenuOfKilnItemsTakesTheEntriesAndClicksReachTheirOrigin) {
  // The view's popup is made of Kiln items; one plain entry of its own is there already.
  auto* Popup = CreateComponentOf<TPopupMenu>(nullptr);
  auto Free = Finally([&]() noexcept { Popup->Destroy(); });
  auto* Refresh = CreateComponentOf<TMenuItem>(Popup);
  Refresh->SetName("Refresh1");
  Refresh->SetCaption("Refresh");
  Refresh->SetShortCut(116);
  IPtr<TClickCounter> Refreshed = New<TClickCounter>();
  Refresh->OnClick = TNotifyEvent::Bind<&TClickCounter::Clicked>(Refreshed.Get());
  Popup->Items()->Add(Refresh);

  OfferLocalMenus();
  IPtr<IOTAStructureNode> Panels = NodeOf(Bar->Panels());
  View->Selected = {Panels};
  IPtr<IOTAStructureNodeMenuItem> Menu = StructureViewAPI::NodeMenuItemOf(Popup->Items());
  Ctx110()->InitPopupMenu(Panels, Menu);
  std::vector<String> Captions;
  for (int I = 0; I < Popup->Items()->Count(); ++I) Captions.push_back(Popup->Items()->Items(I)->Caption());
  EXPECT_EQ(Captions, (std::vector<String>{"-", "Add item", "-", "Edit", "Checked", "Refresh"}));
  auto* Checked = Popup->Items()->Items(4);
  EXPECT_EQ(Checked->Name(), "ItemChecked");
  EXPECT_EQ(Checked->ShortCut(), 16449);

  // A click on the Kiln item goes back to the entry it came from.
  Popup->Items()->Items(1)->Click();
  EXPECT_EQ(Bar->Panels()->Count(), 2);

  // The plain item, read through the view, becomes a fed item in its place that keeps
  // its name, its short cut and its handler, and clicks once.
  IPtr<IOTAStructureNodeMenuItem> Entry = Menu->Get_Item(5);
  ASSERT_TRUE(Entry);
  TMenuItem* Replaced = Popup->Items()->Items(5);
  EXPECT_NE(dynamic_cast<StructureViewAPI::TStructureMenuItem*>(Replaced), nullptr);
  EXPECT_EQ(Replaced->Name(), "Refresh1");
  EXPECT_EQ(Entry->Get_Caption(), "Refresh");
  EXPECT_EQ(Entry->Get_ShortCut(), 116);
  EXPECT_EQ(Entry->Get_ImageIndex(), -1);
  Entry->Invoke();
  Replaced->Click();
  EXPECT_EQ(Refreshed->Count, 2);
  // Deleting through the view frees the item.
  Menu->DeleteItem(5);
  EXPECT_EQ(Popup->Items()->Count(), 5);
  EXPECT_EQ(Menu->Get_Item(7), nullptr);
}

} // namespace
} // namespace formkit::fakes
