//===- tests/frameworks/kiln/design/CollectionEditorTest.cpp - The collection editor window ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "core/DesignIntfClasses.h"
#include "core/DesignNotifications.h"
#include "editors/EditorRegistry.h"
#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/KilnMessages.h"
#include "frameworks/kiln/design/ColnEdit.h"
#include "frameworks/kiln/design/KilnEditors.h"
#include "platform/Registry.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// An item with a name and a kind; with `Twins` set on its collection, adding one adds
/// a second one too.
class TColEdItem : public TCollectionItem {
  FK_CLASS(TColEdItem, TCollectionItem)
  void Create(TCollection* ACollection) override;
  String GetDisplayName() override { return Title; }
  String Title;
  String Kind = "plain";
};

/// A collection that names columns when `Attrs` is above 0.
class TColEdItems : public TOwnedCollection {
  FK_CLASS(TColEdItems, TOwnedCollection)
  TColEdItems() = default;
  explicit TColEdItems(TPersistent* AOwner) : TOwnedCollection(AOwner, TColEdItem::StaticClass()) {}
  int GetAttrCount() override { return Attrs; }
  String GetAttr(int Index) override { return Index == 0 ? "Title" : "Kind"; }
  String GetItemAttr(int Index, int ItemIndex) override {
    auto* Item = static_cast<TColEdItem*>(Items(ItemIndex));
    return Index == 0 ? Item->Title : Item->Kind;
  }
  int Attrs = 0;
  bool Twins = false;
};

void TColEdItem::Create(TCollection* ACollection) {
  inherited::Create(ACollection);
  auto* Owner = dynamic_cast<TColEdItems*>(ACollection);
  if (Owner && Owner->Twins) {
    Owner->Twins = false; // the twin itself brings none
    ACollection->Add();
    Owner->Twins = true;
  }
}

/// A component holding such a collection as its published property "Entries".
class TColEdHolder : public TComponent {
  FK_CLASS(TColEdHolder, TComponent)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    FEntries = new TColEdItems(this);
  }
  void BeforeDestruction() override {
    FreeAndNil(FEntries);
    inherited::BeforeDestruction();
  }
  TColEdItems* Entries() const noexcept { return FEntries; }
  void SetEntries(TColEdItems* Value) { FEntries->Assign(Value); }

private:
  TColEdItems* FEntries = nullptr;
};

FK_IMPLEMENT(TColEdItem, "CollectionEditorTest") {}
FK_IMPLEMENT(TColEdItems, "CollectionEditorTest") {}
FK_IMPLEMENT(TColEdHolder, "CollectionEditorTest") {
  B.Property("Entries", &TColEdHolder::Entries, &TColEdHolder::SetEntries);
}

using Rows = std::vector<String>;

struct CollectionEditorTest : KilnDesignFixture {
  IPtr<IRoot> Form;
  TStatusBar* Bar = nullptr;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Form = NewForm("Form1");
    Bar = CreateComponentOf<TStatusBar>(Form->GetRoot());
    Bar->SetName("StatusBar1");
    Bar->SetParent(static_cast<TWinControl*>(Form->GetRoot()));
    Form->GetDesigner()->Activate();
    Log.Clear();
  }
  void TearDown() override {
    ProcessMessages();
    KilnDesignFixture::TearDown();
  }
  TCollectionEditor* Open(TComponent* Component, TCollection* Collection, const String& Name) {
    return ShowCollectionEditor(Form->GetDesigner(), Component, Collection, Name);
  }
  static Rows Shown(TCollectionEditor* Editor) {
    Rows Texts;
    TListItems* Items = Editor->ListView1()->Items();
    for (int I = 0; I < Items->Count(); ++I) {
      String Text = Items->Item(I)->Caption();
      for (int J = 0; J < Items->Item(I)->SubItems()->Count(); ++J) Text += "|" + Items->Item(I)->SubItems()->Get(J);
      Texts.push_back(Text);
    }
    return Texts;
  }
  static Rows SelectedRows(TCollectionEditor* Editor) {
    Rows Texts;
    TListItems* Items = Editor->ListView1()->Items();
    for (int I = 0; I < Items->Count(); ++I)
      if (Items->Item(I)->Selected()) Texts.push_back(Items->Item(I)->Caption());
    return Texts;
  }
  std::vector<TPersistent*> DesignerSelection() const {
    IPtr<IDesignerSelections> List = CreateSelectionList();
    Form->GetDesigner()->GetSelections(List);
    std::vector<TPersistent*> Items;
    for (int I = 0; I < List->GetCount(); ++I) Items.push_back(List->Get(I));
    return Items;
  }
  TStatusPanel* Panel(int Index) const { return static_cast<TStatusPanel*>(Bar->Panels()->Items(Index)); }
  static bool IsOpen(TCollectionEditor* Editor) {
    const auto* List = CollectionEditorsList();
    return List && std::find(List->begin(), List->end(), Editor) != List->end();
  }
};

TEST_F(CollectionEditorTest, ColEditOpensOneWindowPerPropertyWithItsCommands) {
  TCollectionEditor* Editor = Open(Bar, Bar->Panels(), "Panels");
  EXPECT_EQ(Editor->Caption(), "Editing StatusBar1.Panels");
  EXPECT_EQ(Editor->CollectionClassName(), "TStatusPanels");
  EXPECT_EQ(Editor->Owner(), Application());
  EXPECT_TRUE(Editor->Visible());
  EXPECT_EQ(Open(Bar, Bar->Panels(), "PANELS"), Editor) << "the same property, named in another case";
  TCollectionEditor* Second = Open(Bar, Bar->Panels(), "OtherPanels");
  EXPECT_NE(Second, Editor);
  EXPECT_EQ(CollectionEditorsList()->size(), 2u);

  // The commands as the window's stored form has them.
  struct TExpected {
    TAction* Command;
    const char* Caption;
    const char* Hint;
    int ShortCut;
    const char* Image;
  };
  for (const TExpected& E : {TExpected{Editor->AddCmd(), "&Add", "Add New", vkInsert, "Collections\\Add"},
                             TExpected{Editor->DeleteCmd(), "&Delete", "Delete Selected", vkDelete, "Collections\\Delete"},
                             TExpected{Editor->MoveUpCmd(), "Move &Up", "Move Selected Up", scCtrl | vkUp,
                                       "Collections\\MoveUp"},
                             TExpected{Editor->MoveDownCmd(), "Move Dow&n", "Move Selected Down", scCtrl | vkDown,
                                       "Collections\\MoveDown"},
                             TExpected{Editor->SelectAllCmd(), "&Select All", "", 0, ""}}) {
    EXPECT_EQ(E.Command->Caption(), E.Caption);
    EXPECT_EQ(E.Command->Hint(), E.Hint);
    EXPECT_EQ(E.Command->ShortCut(), E.ShortCut) << E.Caption;
    EXPECT_EQ(Editor->CommandImageName(E.Command), E.Image);
  }
  // The tool bar: add, delete, a gap, the moves; the pop-up: the five and a separator on top.
  Rows Bar1;
  for (int I = 0; I < Editor->ToolBar1()->ControlCount(); ++I) {
    auto* B = dynamic_cast<TToolButton*>(Editor->ToolBar1()->Controls(I));
    if (B) Bar1.push_back(B->Style() == tbsSeparator ? String("-") : B->Caption());
  }
  EXPECT_EQ(Bar1, (Rows{"&Add", "&Delete", "-", "Move &Up", "Move Dow&n"}));
  TMenuItem* Popup = Editor->PopupMenu1()->Items();
  ASSERT_GE(Popup->Count(), 7);
  Rows Menu;
  for (int I = 0; I < 6; ++I) Menu.push_back(Popup->Items(I)->Caption());
  EXPECT_EQ(Menu, (Rows{"&Add", "&Delete", "Move &Up", "Move Dow&n", "&Select All", "-"}));

  // Enabled by the options and the rows: nothing to delete, move or select yet.
  for (TAction* Command : {Editor->DeleteCmd(), Editor->MoveUpCmd(), Editor->SelectAllCmd()}) (void)Command->Update();
  EXPECT_TRUE(Editor->AddCmd()->Enabled());
  EXPECT_FALSE(Editor->DeleteCmd()->Enabled());
  EXPECT_FALSE(Editor->MoveUpCmd()->Enabled());
  EXPECT_FALSE(Editor->SelectAllCmd()->Enabled());
  TCollectionEditor* NoAdd = ShowCollectionEditorClass(Form->GetDesigner(), TCollectionEditor::StaticClass(), Bar,
                                                       Bar->Panels(), "Third", TColOptions{coDelete});
  EXPECT_FALSE(NoAdd->AddCmd()->Enabled());
  try {
    (void)Open(Bar, nullptr, "Nothing");
    FAIL() << "a window without a collection";
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "There is no collection to edit");
  }
  EXPECT_EQ(CollectionEditorsList()->size(), 3u);
}

TEST_F(CollectionEditorTest, ColEditAddsDeletesMovesAndKeepsTheDesignerInStep) {
  TCollectionEditor* Editor = Open(Bar, Bar->Panels(), "Panels");
  EXPECT_EQ(Shown(Editor), Rows{});
  for (int I = 0; I < 3; ++I) Editor->AddCmd()->Execute();
  EXPECT_EQ(Log.Count("Modified"), 3) << "one change of the module for each addition";
  EXPECT_EQ(Shown(Editor), (Rows{"0 - TStatusPanel", "1 - TStatusPanel", "2 - TStatusPanel"}));
  EXPECT_EQ(SelectedRows(Editor), Rows{"2 - TStatusPanel"});
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Panel(2)}));
  Panel(0)->SetText("first");
  Panel(1)->SetText("second");
  Panel(2)->SetText("third");
  Editor->ItemsModified(Form->GetDesigner());
  EXPECT_EQ(Shown(Editor), (Rows{"0 - first", "1 - second", "2 - third"}));

  // A click selects through the message queue; many changes make one update.
  Editor->ListView1()->ClickRow(0);
  EXPECT_EQ(PendingMessageCount(Editor), 1);
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Panel(2)})) << "nothing before the queue runs";
  ProcessMessages();
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Panel(0)}));

  // Moving down keeps the selection, which follows the item's ID.
  TStatusPanel* First = Panel(0);
  Log.Clear();
  Editor->MoveDownCmd()->Execute();
  EXPECT_EQ(Panel(1), First);
  EXPECT_EQ(Log.Count("Modified"), 1);
  EXPECT_EQ(Shown(Editor), (Rows{"0 - second", "1 - first", "2 - third"}));
  EXPECT_EQ(SelectedRows(Editor), Rows{"1 - first"});
  Editor->MoveUpCmd()->Execute();
  Editor->MoveUpCmd()->Execute(); // already at the top: stays
  EXPECT_EQ(Panel(0), First);
  EXPECT_EQ(SelectedRows(Editor), Rows{"0 - first"});

  // The designer selects something else, then the panel again: the window follows it
  // by what it selected last.
  Form->GetDesigner()->SelectComponent(Bar);
  Editor->GetSelection();
  EXPECT_EQ(SelectedRows(Editor), Rows{"0 - first"}) << "the owner selected: the rows of the last selection";
  Form->GetDesigner()->SelectComponent(Form->GetRoot());
  Editor->GetSelection();
  EXPECT_EQ(SelectedRows(Editor), Rows{});
  IPtr<IDesignerSelections> Four = CreateSelectionList();
  for (TPersistent* P : {static_cast<TPersistent*>(Bar), static_cast<TPersistent*>(Panel(0)),
                         static_cast<TPersistent*>(Panel(1)), static_cast<TPersistent*>(Panel(2))})
    Four->Add(P);
  Form->GetDesigner()->SetSelections(Four);
  Editor->GetSelection();
  EXPECT_EQ(SelectedRows(Editor), Rows{}) << "more objects than items: no selection";

  // A drop moves the selected rows to the row dropped on.
  Editor->ListView1()->ClickRow(2);
  ProcessMessages();
  TListView* List = Editor->ListView1();
  const int RowY = [&](int Row) { return Row * TListView::RowHeight + 2; }(0);
  EXPECT_FALSE(List->DragOver(List, 2, 2 * TListView::RowHeight + 2)) << "not on a selected row";
  EXPECT_FALSE(List->DragOver(Editor, 2, RowY)) << "only from the list itself";
  ASSERT_TRUE(List->DragOver(List, 2, RowY));
  List->DragDrop(List, 2, RowY);
  EXPECT_EQ(Shown(Editor), (Rows{"0 - third", "1 - first", "2 - second"}));
  EXPECT_EQ(SelectedRows(Editor), Rows{"0 - third"});

  // Deleting one selects the row that took its place; deleting all clears the collection.
  Log.Clear();
  Editor->DeleteCmd()->Execute();
  EXPECT_EQ(Shown(Editor), (Rows{"0 - first", "1 - second"}));
  EXPECT_EQ(SelectedRows(Editor), Rows{"0 - first"});
  EXPECT_EQ(Log.Count("Modified"), 1);
  Editor->SelectAllCmd()->Execute();
  EXPECT_EQ(Log.Count("Modified"), 1) << "selecting changes nothing";
  Editor->DeleteCmd()->Execute();
  EXPECT_EQ(Bar->Panels()->Count(), 0);
  EXPECT_EQ(Shown(Editor), Rows{});
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Bar->Panels()})) << "no row: the collection itself";
}

TEST_F(CollectionEditorTest, ColEditFollowsDeletionsAndClosesWithItsComponentOrModule) {
  Bar->Panels()->Add();
  Bar->Panels()->Add();
  TCollectionEditor* Editor = Open(Bar, Bar->Panels(), "Panels");
  EXPECT_EQ(Shown(Editor).size(), 2u);

  // One item deleted in the designer: refreshed by message, after the deletion.
  TCollectionItem* Gone = Bar->Panels()->Items(0);
  DesignNotificationItemDeleted(Form->GetDesigner(), Gone);
  EXPECT_EQ(PendingMessageCount(Editor), 1);
  Gone->Destroy();
  ProcessMessages();
  EXPECT_EQ(Shown(Editor), Rows{"0 - TStatusPanel"});

  // Rows equal to the collection are left alone, with their scroll position.
  const int Redraws = Editor->ListView1()->RedrawCount();
  Editor->ItemsModified(Form->GetDesigner());
  EXPECT_EQ(Editor->ListView1()->RedrawCount(), Redraws);

  // The owner deleted: the window closes and ignores what comes after.
  Bar->Destroy();
  Bar = nullptr;
  EXPECT_TRUE(Editor->Closing());
  EXPECT_EQ(Editor->Collection, nullptr);
  Editor->AddCmd()->Execute(); // closed: nothing to add to
  Editor->ItemsModified(Form->GetDesigner());
  EXPECT_EQ(Shown(Editor), Rows{"0 - TStatusPanel"});
  ProcessMessages();
  EXPECT_FALSE(IsOpen(Editor));

  // The module closed: its designer's windows close with it.
  auto* Holder = CreateComponentOf<TColEdHolder>(Form->GetRoot());
  Holder->SetName("Holder1");
  TCollectionEditor* Other = Open(Holder, Holder->Entries(), "Entries");
  Form->Close();
  ProcessMessages();
  EXPECT_FALSE(IsOpen(Other));
}

TEST_F(CollectionEditorTest, ColEditRowsColumnsAndCollectionsThatAddMore) {
  auto* Holder = CreateComponentOf<TColEdHolder>(Form->GetRoot());
  Holder->SetName("Holder1");
  TColEdItems* Entries = Holder->Entries();
  Entries->Add();
  TCollectionEditor* Editor = Open(Holder, Entries, "Entries");
  EXPECT_EQ(Shown(Editor), Rows{"0 - "}) << "an empty display name";
  ASSERT_EQ(Editor->ListView1()->Columns()->Count(), 1);
  EXPECT_EQ(Editor->ListView1()->Columns()->Column(0)->Width(), -1);
  EXPECT_FALSE(Editor->ListView1()->ShowColumnHeaders());

  // With attributes: a column each, captioned, and the rows' sub-items.
  Entries->Attrs = 2;
  static_cast<TColEdItem*>(Entries->Items(0))->Title = "alpha";
  Editor->UpdateListbox();
  ASSERT_EQ(Editor->ListView1()->Columns()->Count(), 2);
  EXPECT_EQ(Editor->ListView1()->Columns()->Column(1)->Caption(), "Kind");
  EXPECT_EQ(Editor->ListView1()->Columns()->Column(1)->Width(), -2);
  EXPECT_TRUE(Editor->ListView1()->ShowColumnHeaders());
  EXPECT_EQ(Shown(Editor), Rows{"alpha|plain"});

  // A collection that adds a second item by itself: the list is read again.
  Entries->Twins = true;
  Editor->AddCmd()->Execute();
  EXPECT_EQ(Entries->Count(), 3);
  EXPECT_EQ(Shown(Editor), (Rows{"alpha|plain", "|plain", "|plain"}));

  // Through the inspector's editor of the property.
  Editor->Close();
  ProcessMessages();
  IPtr<IDesignerSelections> One = CreateSelectionList();
  One->Add(Holder);
  IPtr<IProperty> Property;
  GetComponentProperties(One, tkAny, Form->GetDesigner(), [&](const IPtr<IProperty>& P) {
    if (P->GetName() == "Entries") Property = P;
  });
  ASSERT_TRUE(Property);
  EXPECT_EQ(Property->GetAttributes(), (TPropertyAttributes{paDialog, paReadOnly, paKiln}));
  Property->Edit();
  ASSERT_EQ(CollectionEditorsList()->size(), 1u);
  EXPECT_EQ(CollectionEditorsList()->front()->Caption(), "Editing Holder1.Entries");
}

TEST_F(CollectionEditorTest, ColEditKeepsItsStateAndClosesOnASelectionFailure) {
  auto Cleanup = Finally([]() noexcept {
    TRegistry Reg;
    (void)Reg.DeleteKey("\\Software\\FormkitTest");
    BaseRegistryKey.clear();
  });
  BaseRegistryKey = "Software\\FormkitTest\\Coln";
  Bar->Panels()->Add();
  TCollectionEditor* Editor = Open(Bar, Bar->Panels(), "Panels");
  Editor->SetBounds(100, 120, 300, 200);
  Editor->SetLargeButtons(false);
  Editor->Close();
  ProcessMessages();
  {
    TRegistry Reg;
    ASSERT_TRUE(Reg.OpenKey("\\Software\\FormkitTest\\Coln\\Collection Editor\\TStatusPanels", false));
    EXPECT_EQ(Reg.ReadString("Left"), "100");
    EXPECT_EQ(Reg.ReadString("Width"), "300");
    EXPECT_EQ(Reg.ReadString("Column0"), "-1");
    EXPECT_EQ(Reg.ReadString("LargeButtons"), "0");
    EXPECT_EQ(Reg.ReadString("Toolbar"), "1");
  }
  EXPECT_EQ(DesignerSelection(), (std::vector<TPersistent*>{Bar})) << "closing selects the component";

  // Read back by the next window of the same collection class.
  Editor = Open(Bar, Bar->Panels(), "Panels");
  EXPECT_EQ(Editor->Width(), 300);
  EXPECT_EQ(Editor->Left(), 100);
  EXPECT_FALSE(Editor->LargeButtons());

  // The collection emptied behind the window's back: selecting its stale row fails once,
  // the failure is shown, and the window closes.
  Bar->Panels()->Clear();
  Application()->ClearShownExceptions();
  Editor->ListView1()->ClickRow(0);
  ProcessMessages();
  ASSERT_EQ(Application()->ShownExceptions().size(), 1u);
  EXPECT_EQ(Application()->ShownExceptions()[0], "List index out of bounds (0)");
  EXPECT_FALSE(IsOpen(Editor));
}

TEST_F(CollectionEditorTest, ColEditHandsTypingToTheInspector) {
  Bar->Panels()->Add();
  TCollectionEditor* Editor = Open(Bar, Bar->Panels(), "Panels");
  Log.Clear();
  char Key = 'a';
  Editor->ListView1()->KeyPress(Key);
  EXPECT_EQ(Key, 0) << "the key goes to the inspector";
  char Blank = ' ';
  Editor->ListView1()->KeyPress(Blank);
  EXPECT_EQ(Blank, ' ');
  char Enter = '\r';
  Editor->FormKeyPress(Enter);
  EXPECT_EQ(Log.Count("ModalEdit"), 2);
}

} // namespace
