//===- frameworks/kiln/design/ColnEdit.cpp - The collection editor window --===//
#include "frameworks/kiln/design/ColnEdit.h"

#include "core/DesignCore.h"
#include "core/DesignIntfClasses.h"
#include "core/Designers.h"
#include "frameworks/kiln/KilnMenus.h"
#include "frameworks/kiln/design/DialogState.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <map>

namespace formkit {

FK_IMPLEMENT(TCollectionEditor, "ColnEdit") {}

FK_RESOURCESTRING(SNoCollectionToEdit, "There is no collection to edit");

namespace {

/// Every open editor; made by the first `ShowCollectionEditorClass`.
std::unique_ptr<std::vector<TCollectionEditor*>> GEditors;

/// The separator of a property path.
constexpr const char* DotSep = ".";

/// The key code an input method sends for a key it is composing.
constexpr std::uint16_t ProcessKey = 229;

/// Whether walking from `Item` through `GetOwner`, stopping at the first component,
/// reaches `Owner`.
bool IsOwnedBy(TPersistent* Item, const TPersistent* Owner) {
  for (TPersistent* P = Item ? Item->GetOwner() : nullptr; P; P = P->GetOwner()) {
    if (P == Owner) return true;
    if (dynamic_cast<TComponent*>(P)) return false;
  }
  return false;
}

/// A row as fetched: its caption and sub-items.
struct TFetchedRow {
  String Caption;
  std::vector<String> SubItems;
};

} // namespace

const std::vector<TCollectionEditor*>* CollectionEditorsList() noexcept { return GEditors.get(); }

//===----------------------------------------------------------------------===//
// The window
//===----------------------------------------------------------------------===//

void TCollectionEditor::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetCaption(LoadResString(SColEditCaption));
  SetClientWidth(120);
  SetClientHeight(122);
  MakeListView();
  MakeCommands();
  OnClose = TCloseEvent::Bind<&TCollectionEditor::FormClose>(this);
  if (GEditors) GEditors->push_back(this);
}

void TCollectionEditor::BeforeDestruction() {
  if (GEditors) std::erase(*GEditors, this);
  RemoveMessages(this);
  inherited::BeforeDestruction();
}

void TCollectionEditor::MakeListView() {
  FListView1 = CreateComponentOf<TListView>(this);
  FListView1->SetName("ListView1");
  FListView1->SetAlign(alClient);
  FListView1->SetViewStyle(vsReport);
  FListView1->SetReadOnly(true);
  FListView1->SetMultiSelect(true);
  FListView1->SetRowSelect(true);
  FListView1->SetDragMode(dmAutomatic);
  FListView1->SetColumnClick(false);
  FListView1->SetShowColumnHeaders(false);
  FListView1->SetParent(this);
  FListView1->OnChange = TLVChangeEvent::Bind<&TCollectionEditor::ListView1Change>(this);
  FListView1->OnDragOver = TListDragOverEvent::Bind<&TCollectionEditor::ListView1DragOver>(this);
  FListView1->OnDragDrop = TListDragDropEvent::Bind<&TCollectionEditor::ListView1DragDrop>(this);
  FListView1->OnKeyPress = TListKeyPressEvent::Bind<&TCollectionEditor::ListView1KeyPress>(this);
  FListView1->OnKeyDown = TKeyEvent::Bind<&TCollectionEditor::ListView1KeyDown>(this);
}

TAction* TCollectionEditor::MakeCommand(const String& Name, const String& Caption, const String& Hint, int ShortCut,
                                        TNotifyEvent Execute) {
  auto* Command = CreateComponentOf<TAction>(this);
  Command->SetName(Name);
  Command->SetCaption(Caption);
  Command->SetHint(Hint);
  Command->SetShortCut(ShortCut);
  Command->SetActionList(ActionList1());
  Command->OnExecute = Execute;
  if (Name != "AddCmd") Command->OnUpdate = TNotifyEvent::Bind<&TCollectionEditor::CommandUpdate>(this);
  return Command;
}

void TCollectionEditor::MakeCommands() {
  using Self = TCollectionEditor;
  FAddCmd = MakeCommand("AddCmd", "&Add", "Add New", vkInsert, TNotifyEvent::Bind<&Self::AddClick>(this));
  FAddCmd->SetEnabled(false); // until the options allow it
  FDeleteCmd =
      MakeCommand("DeleteCmd", "&Delete", "Delete Selected", vkDelete, TNotifyEvent::Bind<&Self::DeleteClick>(this));
  FMoveUpCmd = MakeCommand("MoveUpCmd", "Move &Up", "Move Selected Up", scCtrl | vkUp,
                           TNotifyEvent::Bind<&Self::MoveUpClick>(this));
  FMoveDownCmd = MakeCommand("MoveDownCmd", "Move Dow&n", "Move Selected Down", scCtrl | vkDown,
                             TNotifyEvent::Bind<&Self::MoveDownClick>(this));
  FSelectAllCmd =
      MakeCommand("SelectAllCmd", "&Select All", "", 0, TNotifyEvent::Bind<&Self::SelectAllCommandExecute>(this));
  // The tool bar: add and delete, a gap, the two moves.
  for (TAction* Command : {FAddCmd, FDeleteCmd, static_cast<TAction*>(nullptr), FMoveUpCmd, FMoveDownCmd}) {
    auto* Button = CreateComponentOf<TToolButton>(this);
    Button->SetStyle(Command ? tbsButton : tbsSeparator);
    Button->SetAction(Command);
    Button->SetParent(ToolBar1());
  }
  // The pop-up menu: the five commands above the inherited entries, then a separator.
  int At = 0;
  for (TAction* Command : {FAddCmd, FDeleteCmd, FMoveUpCmd, FMoveDownCmd, FSelectAllCmd}) {
    auto* Item = CreateComponentOf<TMenuItem>(this);
    Item->SetAction(Command);
    PopupMenu1()->Items()->Insert(At++, Item);
  }
  auto* Line = CreateComponentOf<TMenuItem>(this);
  Line->SetCaption("-");
  PopupMenu1()->Items()->Insert(At, Line);
}

String TCollectionEditor::CommandImageName(const TAction* Command) const {
  static const std::map<String, String> Images{{"AddCmd", "Collections\\Add"},
                                               {"DeleteCmd", "Collections\\Delete"},
                                               {"MoveUpCmd", "Collections\\MoveUp"},
                                               {"MoveDownCmd", "Collections\\MoveDown"}};
  if (!Command || Command->Owner() != this) return String();
  auto It = Images.find(Command->Name());
  return It == Images.end() ? String() : It->second;
}

void TCollectionEditor::CommandUpdate(TObject* Sender) {
  auto* Command = static_cast<TAction*>(Sender);
  const bool Selected = FListView1->Selected() != nullptr;
  if (Command == FDeleteCmd) Command->SetEnabled(Selected && FColOptions.Contains(coDelete));
  else if (Command == FMoveUpCmd || Command == FMoveDownCmd) Command->SetEnabled(Selected && FColOptions.Contains(coMove));
  else if (Command == FSelectAllCmd) Command->SetEnabled(FListView1->Items()->Count() > 0);
}

void TCollectionEditor::SetColOptions(TColOptions Value) {
  FColOptions = Value;
  FAddCmd->SetEnabled(Value.Contains(coAdd));
}

void TCollectionEditor::SetCollectionPropertyName(const String& Value) {
  if (Value == FCollectionPropertyName) return;
  FCollectionPropertyName = Value;
  SetCaption(Format(LoadResString(SColEditCaption), Component ? Component->Name() : String(), DotSep, Value));
}

bool TCollectionEditor::CanAdd(int) { return true; }

void TCollectionEditor::Activated() {
  if (Designer()) Designer()->Activate();
  SetSelection();
}

//===----------------------------------------------------------------------===//
// The rows
//===----------------------------------------------------------------------===//

String TCollectionEditor::GetItemName(int Index, int ItemIndex) {
  if (Collection->GetAttrCount() < 1)
    return Format("%d - %s", ItemIndex, Collection->Items(ItemIndex)->GetDisplayName());
  return Collection->GetItemAttr(Index, ItemIndex);
}

void TCollectionEditor::UpdateColumns() {
  const int Attrs = Collection->GetAttrCount();
  TListColumns* Columns = FListView1->Columns();
  if (!((Attrs >= 1 && Attrs != Columns->Count()) || (Columns->Count() == 0 && Attrs < 1))) return;
  FListView1->HandleNeeded();
  Columns->Clear();
  if (Attrs < 1) {
    Columns->Add()->SetWidth(-1);
  } else {
    for (int I = 0; I < Attrs; ++I) {
      TListColumn* Column = Columns->Add();
      Column->SetCaption(Collection->GetAttr(I));
      Column->SetWidth(-2);
    }
    FListView1->SetShowColumnHeaders(true);
  }
  ReadWindowState();
}

void TCollectionEditor::UpdateListbox() {
  if (!Collection) return;
  LockState();
  auto Unlock = Finally([this]() noexcept { UnlockState(); });
  std::vector<TFetchedRow> Fetched;
  const int Attrs = Collection->GetAttrCount();
  for (int I = 0; I < Collection->Count(); ++I) {
    if (!CanAdd(I)) continue;
    TFetchedRow Row{GetItemName(0, I), {}};
    for (int J = 1; J < Attrs; ++J) Row.SubItems.push_back(GetItemName(J, I));
    Fetched.push_back(std::move(Row));
  }
  TListItems* Rows = FListView1->Items();
  bool Equal = Rows->Count() == static_cast<int>(Fetched.size());
  for (int I = 0; Equal && I < Rows->Count(); ++I) {
    const TFetchedRow& Row = Fetched[static_cast<std::size_t>(I)];
    TListItem* Shown = Rows->Item(I);
    Equal = Shown->Caption() == Row.Caption;
    for (std::size_t J = 0; Equal && J < Row.SubItems.size(); ++J)
      Equal = static_cast<int>(J) < Shown->SubItems()->Count() && Shown->SubItems()->Get(static_cast<int>(J)) == Row.SubItems[J];
  }
  if (!Fetched.empty() && Equal) return;
  Rows->BeginUpdate();
  auto End = Finally([Rows]() noexcept { Rows->EndUpdate(); });
  UpdateColumns();
  Rows->Clear();
  for (const TFetchedRow& Row : Fetched) {
    TListItem* Shown = Rows->Add();
    Shown->SetCaption(Row.Caption);
    for (const String& Sub : Row.SubItems) Shown->SubItems()->Add(Sub);
  }
}

void TCollectionEditor::SelectAll(bool DoUpdate) {
  LockState();
  {
    auto Unlock = Finally([this]() noexcept { UnlockState(); });
    for (int I = 0; I < FListView1->Items()->Count(); ++I) FListView1->Items()->Item(I)->SetSelected(true);
  }
  if (DoUpdate) SetSelection();
}

void TCollectionEditor::SelectNone(bool DoUpdate) {
  LockState();
  {
    auto Unlock = Finally([this]() noexcept { UnlockState(); });
    FListView1->ClearSelection();
  }
  if (DoUpdate) SetSelection();
}

//===----------------------------------------------------------------------===//
// The selection, both ways
//===----------------------------------------------------------------------===//

void TCollectionEditor::SetSelection() {
  if (Component && Component->ComponentState().Contains(csAncestor)) UpdateListbox();
  if (FSelectionError || !Collection || !Designer()) return;
  try {
    if (FListView1->SelCount() == 0) {
      Designer()->SelectComponent(Collection);
      return;
    }
    FItemIDList.clear();
    IPtr<IDesignerSelections> List = CreateSelectionList();
    for (int I = 0; I < FListView1->Items()->Count(); ++I) {
      if (!FListView1->Items()->Item(I)->Selected()) continue;
      TCollectionItem* Item = Collection->Items(I);
      List->Add(Item);
      FItemIDList.push_back(Item->ID());
    }
    Designer()->SetSelections(List);
  } catch (const std::exception& E) {
    FSelectionError = true;
    Application()->ShowException(E);
    Close();
  }
}

void TCollectionEditor::GetSelection() {
  LockState();
  {
    auto Unlock = Finally([this]() noexcept { UnlockState(); });
    FListView1->ClearSelection();
  }
  if (!Collection || !Designer()) return;
  IPtr<IDesignerSelections> List = CreateSelectionList();
  Designer()->GetSelections(List);
  if (List->GetCount() == 0 || List->GetCount() > Collection->Count()) return;
  TPersistent* First = List->Get(0);
  if (First != Component && First != Collection && !(First && First->GetOwner() == Collection)) return;
  if (List->GetCount() > FListView1->Items()->Count()) UpdateListbox();
  LockState();
  auto Unlock = Finally([this]() noexcept { UnlockState(); });
  for (std::size_t I = FItemIDList.size(); I-- > 0;) {
    if (TCollectionItem* Item = Collection->FindItemID(FItemIDList[I])) {
      if (Item->Index() < FListView1->Items()->Count()) FListView1->Items()->Item(Item->Index())->SetSelected(true);
    } else {
      FItemIDList.erase(FItemIDList.begin() + static_cast<std::ptrdiff_t>(I));
    }
  }
}

//===----------------------------------------------------------------------===//
// Design notifications and closing
//===----------------------------------------------------------------------===//

bool TCollectionEditor::OwnedByCollection(TPersistent* AItem) const { return IsOwnedBy(AItem, Collection); }
bool TCollectionEditor::CollectionOwnedBy(TPersistent* AItem) const { return IsOwnedBy(Collection, AItem); }

void TCollectionEditor::ItemDeleted(const IPtr<IDesigner>&, TPersistent* AItem) {
  if (!AItem || FClosing) return;
  if (!Component || Component->ComponentState().Contains(csDestroying) || AItem == Component ||
      AItem == Collection || CollectionOwnedBy(AItem)) {
    CloseEditor();
  } else if (OwnedByCollection(AItem)) {
    PostMessage(this, AM_DeferUpdate, 1, 0);
  }
}

void TCollectionEditor::DesignerClosed(const IPtr<IDesigner>& ADesigner, bool) {
  if (ADesigner && Designer() && ADesigner.Get() == Designer().Get()) CloseEditor();
}

void TCollectionEditor::ItemsModified(const IPtr<IDesigner>&) {
  if (FClosing || !Collection) return;
  UpdateListbox();
  IPtr<IRoot> Active = ActiveRoot();
  if (Active && Designer() && Active->GetDesigner().Get() == Designer().Get()) GetSelection();
}

void TCollectionEditor::CloseEditor() {
  FClosing = true;
  Collection = nullptr;
  Component = nullptr;
  Close();
}

void TCollectionEditor::FormClose(TObject*, TCloseAction& Action) {
  if (Component && Designer()) Designer()->SelectComponent(Component);
  WriteWindowState();
  Action = caFree;
  LockState();
}

void TCollectionEditor::ReadWindowState() {
  TIDEDialogRegistryServices State("Collection Editor\\" + FCollectionClassName, false, this);
  State.ReadFormBounds();
  SetToolbarVisible(State.ReadBool("Toolbar", true));
  SetLargeButtons(State.ReadBool("LargeButtons", true));
  TListColumns* Columns = FListView1->Columns();
  if (Columns->Count() <= 1) return;
  for (int I = 0; I < Columns->Count(); ++I) {
    TListColumn* Column = Columns->Column(I);
    const String Ident = Format("Column%d", I);
    int Width = Column->Width();
    if (State.ValueExists(Ident)) {
      int Kept = State.ReadInteger(Ident, Width, false);
      Width = Kept > 0 ? State.ReadInteger(Ident, Width, true) : Kept;
    }
    Column->SetWidth(Width);
  }
}

void TCollectionEditor::WriteWindowState() {
  TIDEDialogRegistryServices State("Collection Editor\\" + FCollectionClassName, false, this);
  State.EraseSection();
  State.WriteFormBounds();
  State.WriteBool("LargeButtons", LargeButtons());
  State.WriteBool("Toolbar", ToolbarVisible());
  TListColumns* Columns = FListView1->Columns();
  for (int I = 0; I < Columns->Count(); ++I) {
    int Width = Columns->Column(I)->Width();
    State.WriteInteger(Format("Column%d", I), Width, Width > 0);
  }
}

//===----------------------------------------------------------------------===//
// Commands
//===----------------------------------------------------------------------===//

void TCollectionEditor::AddClick(TObject*) {
  if (!Collection) return; // closed: the commands have nothing to work on
  SelectNone(false);
  {
    const int Before = Collection->Count();
    Collection->BeginUpdate();
    auto End = Finally([this]() noexcept { RunIgnoringExceptions([this] { Collection->EndUpdate(); }); });
    Collection->Add();
    if (Collection->Count() == Before + 1 && CanAdd(Before)) {
      LockState();
      auto Unlock = Finally([this]() noexcept { UnlockState(); });
      TListItem* Row = FListView1->Items()->Add();
      Row->SetCaption(GetItemName(0, Before));
      for (int J = 1; J < Collection->GetAttrCount(); ++J) Row->SubItems()->Add(GetItemName(J, Before));
      Row->SetSelected(true);
    } else {
      UpdateListbox();
    }
  }
  SetSelection();
  if (Designer()) Designer()->Modified();
  if (int Last = FListView1->Items()->Count() - 1; Last >= 0) {
    FListView1->Items()->Item(Last)->SetFocused(true);
    FListView1->Items()->Item(Last)->MakeVisible(false);
  }
}

void TCollectionEditor::DeleteClick(TObject*) {
  if (!Collection) return;
  int Remembered = -1;
  {
    Collection->BeginUpdate();
    auto End = Finally([this]() noexcept { RunIgnoringExceptions([this] { Collection->EndUpdate(); }); });
    if (Designer()) Designer()->SetSelections(nullptr);
    TListItem* First = FListView1->Selected();
    Remembered = First ? First->Index() : -1;
    const int Selected = FListView1->SelCount();
    if (Selected == Collection->Count()) {
      Collection->Clear();
    } else if (Selected > 0) {
      for (int I = FListView1->Items()->Count() - 1; I >= 0; --I)
        if (FListView1->Items()->Item(I)->Selected()) Collection->Items(I)->Destroy();
    }
  }
  UpdateListbox();
  if (const int Row = std::min(Remembered, FListView1->Items()->Count() - 1); Row >= 0) {
    LockState();
    auto Unlock = Finally([this]() noexcept { UnlockState(); });
    FListView1->Items()->Item(Row)->SetSelected(true);
  }
  SetSelection();
  if (Designer()) Designer()->Modified();
}

void TCollectionEditor::MoveSelected(bool Down) {
  if (!Collection) return;
  TListItems* Rows = FListView1->Items();
  const int Selected = FListView1->SelCount();
  if (Selected == 0 || Selected == Rows->Count()) return;
  std::vector<int> Chosen;
  for (int I = 0; I < Rows->Count(); ++I)
    if (Rows->Item(I)->Selected()) Chosen.push_back(I);
  int Target = Down ? Chosen.back() : Chosen.front();
  if (Down && Target != Rows->Count() - 1) ++Target;
  if (!Down && Target > 0) --Target;
  if (Down) std::reverse(Chosen.begin(), Chosen.end());
  {
    Collection->BeginUpdate();
    auto End = Finally([this]() noexcept { RunIgnoringExceptions([this] { Collection->EndUpdate(); }); });
    // The items are taken by their rows before any moves, as the rows stand.
    std::vector<TCollectionItem*> Items;
    for (int Row : Chosen) Items.push_back(Collection->Items(Row));
    for (TCollectionItem* Item : Items) {
      Item->SetIndex(Target);
      Target += Down ? -1 : 1;
    }
  }
  GetSelection();
  if (Designer()) Designer()->Modified();
}

void TCollectionEditor::MoveUpClick(TObject*) { MoveSelected(false); }
void TCollectionEditor::MoveDownClick(TObject*) { MoveSelected(true); }
void TCollectionEditor::SelectAllCommandExecute(TObject*) { SelectAll(true); }

//===----------------------------------------------------------------------===//
// List events, keys and messages
//===----------------------------------------------------------------------===//

void TCollectionEditor::ListView1Change(TObject*, TListItem*, TItemChange Change) {
  if (Change != ctState || FStateLock > 0) return;
  // Many selection events collapse into one update.
  if (!MessageQueued(this, AM_DeferUpdate)) PostMessage(this, AM_DeferUpdate, 0, 0);
}

void TCollectionEditor::ListView1DragOver(TObject*, TObject* Source, int X, int Y, bool& Accept) {
  TListItem* Row = FListView1->GetItemAt(X, Y);
  Accept = Source == FListView1 && Row && !Row->Selected();
}

void TCollectionEditor::ListView1DragDrop(TObject*, TObject*, int X, int Y) {
  TListItem* Row = FListView1->GetItemAt(X, Y);
  if (!Row || !Collection) return;
  int Target = Row->Index();
  std::vector<TCollectionItem*> Items;
  for (int I = 0; I < FListView1->Items()->Count(); ++I)
    if (FListView1->Items()->Item(I)->Selected()) Items.push_back(Collection->Items(I));
  {
    Collection->BeginUpdate();
    auto End = Finally([this]() noexcept { RunIgnoringExceptions([this] { Collection->EndUpdate(); }); });
    for (TCollectionItem* Item : Items) {
      const int Old = Item->Index();
      Item->SetIndex(Target);
      if (Old > Target && Target < Collection->Count()) ++Target;
    }
  }
  GetSelection();
  if (Designer()) Designer()->Modified();
}

void TCollectionEditor::ModalEditKey(char Key) { ActivateInspector(Key); }

void TCollectionEditor::FormKeyPress(char& Key) {
  if (Key == '\r' || static_cast<unsigned char>(Key) == ProcessKey) ModalEditKey('\0');
}

void TCollectionEditor::ListView1KeyPress(TObject*, char& Key) {
  if (Key >= 33 && Key <= 126) {
    ModalEditKey(Key);
    Key = 0;
  }
}

void TCollectionEditor::ListView1KeyDown(TObject*, std::uint16_t& Key, TShiftState) {
  if (Key == ProcessKey) ModalEditKey('\0');
}

void TCollectionEditor::WndProc(TMessage& Message) {
  if (Message.Msg == AM_DeferUpdate) {
    AMDeferUpdate(Message.WParam, Message.LParam);
    return;
  }
  inherited::WndProc(Message);
}

void TCollectionEditor::AMDeferUpdate(std::intptr_t WParam, std::intptr_t LParam) {
  if (FStateLock > 0) {
    PostMessage(this, AM_DeferUpdate, WParam, LParam);
  } else if (WParam != 0) {
    ItemsModified(nullptr);
  } else {
    SetSelection();
  }
}

void TCollectionEditor::ScaleForPPI(int NewPPI) {
  TListColumns* Columns = FListView1 ? FListView1->Columns() : nullptr;
  const bool HasColumn = Columns && Columns->Count() > 0;
  if (HasColumn) {
    // -1 and -2 are swapped so that the list view computes the width anew.
    FListViewWidth = Columns->Column(0)->Width();
    if (FListViewWidth == -1) FListViewWidth = -2;
    else if (FListViewWidth == -2) FListViewWidth = -1;
  }
  inherited::ScaleForPPI(NewPPI);
  if (HasColumn) Columns->Column(0)->SetWidth(FListViewWidth);
}

//===----------------------------------------------------------------------===//
// Opening
//===----------------------------------------------------------------------===//

TCollectionEditor* ShowCollectionEditorClass(const IPtr<IDesigner>& ADesigner,
                                             TCollectionEditorClass CollectionEditorClass, TComponent* AComponent,
                                             TCollection* ACollection, const String& PropertyName,
                                             TColOptions ColOptions) {
  if (!ACollection) throw EInvalidOperation(SNoCollectionToEdit);
  if (!GEditors) GEditors = std::make_unique<std::vector<TCollectionEditor*>>();
  for (TCollectionEditor* Open : *GEditors) {
    if (Open->Designer().Get() == ADesigner.Get() && Open->Component == AComponent &&
        Open->Collection == ACollection && SameText(Open->CollectionPropertyName(), PropertyName)) {
      Open->Show();
      return Open;
    }
  }
  TClass Class = CollectionEditorClass ? CollectionEditorClass : TCollectionEditor::StaticClass();
  auto* Editor = static_cast<TCollectionEditor*>(CreateComponent(Class, Application()));
  auto Free = OnFailure([Editor]() noexcept { Editor->Destroy(); });
  Editor->SetColOptions(ColOptions);
  Editor->SetDesigner(ADesigner);
  Editor->Collection = ACollection;
  Editor->SetCollectionClassName(ACollection->ClassName());
  Editor->Component = AComponent;
  Editor->SetCollectionPropertyName(PropertyName);
  Editor->UpdateListbox();
  Editor->Show();
  return Editor;
}

TCollectionEditor* ShowCollectionEditor(const IPtr<IDesigner>& ADesigner, TComponent* AComponent,
                                        TCollection* ACollection, const String& PropertyName) {
  return ShowCollectionEditorClass(ADesigner, TCollectionEditor::StaticClass(), AComponent, ACollection, PropertyName,
                                   TColOptions{coAdd, coDelete, coMove});
}

void RegisterCollectionEditor() {
  // The unit's finalisation: when the core stops, the open editors go.
  static const bool StepAdded = [] {
    AddDesignCoreStep(TCoreStage::DefaultRegistrations, "CollectionEditor", nullptr, &UnregisterCollectionEditor);
    return true;
  }();
  (void)StepAdded;
  DefaultCollectionEditorClass = TCollectionEditor::StaticClass();
  ShowCollectionEditorProc = [](const IPtr<IDesigner>& Designer, TClass EditorClass, TComponent* Component,
                                TCollection* Collection, const String& PropertyName, TColOptions Options) {
    ShowCollectionEditorClass(Designer, EditorClass, Component, Collection, PropertyName, Options);
  };
}

void UnregisterCollectionEditor() noexcept {
  ShowCollectionEditorProc = nullptr;
  DefaultCollectionEditorClass = nullptr;
  if (!GEditors) return;
  // Each editor leaves the list as it goes.
  while (!GEditors->empty()) GEditors->back()->Destroy();
  GEditors.reset();
}

} // namespace formkit
