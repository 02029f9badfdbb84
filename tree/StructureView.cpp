//===- tree/StructureView.cpp - The tree behind the host's structure view ===//
//
// The nodes with their self-breaking back links, the context's answers to the
// view, the two-way selection sync with its lock and the idle-deferred empty
// selection, the toolbar, the delete key and the edit commands.
//
//===----------------------------------------------------------------------===//
#include "tree/StructureView.h"

#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit {

//===----------------------------------------------------------------------===//
// The watch on a sprig
//===----------------------------------------------------------------------===//

void detail::TSprigWatch::Changed(TInformant* ASender) {
  if (ASender && ASender->IsDestroying() && FNode) FNode->ClearSprig();
  inherited::Changed(ASender);
}

namespace detail {
FK_IMPLEMENT(TSprigWatch, "StructureView") {}
} // namespace detail
FK_IMPLEMENT(TSprigStructureNode, "StructureView") {}
FK_IMPLEMENT(TRootSprigStructureNode, "StructureView") {}
FK_IMPLEMENT(TRootSprigStructureContext, "StructureView") {}
FK_IMPLEMENT(TInternalDragSprigs, "StructureView") {}

namespace {

/// The delete key of the view, and the shift bits that keep it from deleting.
constexpr std::uint16_t DeleteKey = 46;
constexpr std::uint16_t DeleteBlockingShift = 12;

/// The toolbar's images, relative to `GToolButtonImageOffset`: the separator and the
/// button after it share a number.
constexpr int ButtonImages[5] = {4, 5, 6, 6, 7};

using detail::Shielded;

IPtr<IOTAStructureView> View() { return IDEService<IOTAStructureView>(); }

/// Whether the view says it is changing its own selection.
bool ViewBusy(const IPtr<IOTAStructureView>& AView) {
  IPtr<IOTAStructureView290> Busy = QueryAs<IOTAStructureView290>(AView);
  return Busy && Busy->GetBusy() != OTAFalse;
}

TSprig* SprigOf(const IPtr<IOTAStructureNode>& ANode) {
  IPtr<ISprig> Sprig = QueryAs<ISprig>(ANode);
  return Sprig ? Sprig->GetSprig() : nullptr;
}

/// The same selection: the list's own comparison, or the same entries in any order.
bool SameSelection(const IPtr<IDesignerSelections>& Old, const IPtr<IDesignerSelections>& New) {
  if (Old->Equals(New)) return true;
  if (Old->GetCount() == 0 || Old->GetCount() != New->GetCount()) return false;
  for (int I = 0; I < Old->GetCount(); ++I) {
    bool Found = false;
    for (int J = 0; J < New->GetCount() && !Found; ++J) Found = Old->Get(I) == New->Get(J);
    if (!Found) return false;
  }
  return true;
}

IPtr<IDesignerSelections> NewSelections() { return InterfaceOf<IDesignerSelections>(New<TDesignerSelections>().Get()); }

} // namespace

//===----------------------------------------------------------------------===//
// Nodes
//===----------------------------------------------------------------------===//

TSprigStructureNode::TSprigStructureNode(TSprig* ASprig) : FSprig(ASprig) {
  if (!ASprig) return;
  FWatch.Reset(new detail::TSprigWatch(this));
  FWatch->Notify(ASprig);
}

void TSprigStructureNode::BeforeDestruction() {
  FWatch.Reset(); // unlinks from a sprig that still lives
  inherited::BeforeDestruction();
}

void TSprigStructureNode::ClearSprig() noexcept { FSprig = nullptr; }

IPtr<IOTAStructureNode> TSprigStructureNode::GetParent() {
  return Shielded(IPtr<IOTAStructureNode>(), [this] {
    return FSprig && FSprig->Parent() ? StructureNodeFor(FSprig->Parent()) : IPtr<IOTAStructureNode>();
  });
}

String TSprigStructureNode::GetCaption() {
  return Shielded(String(), [this] { return FSprig ? FSprig->Caption() : String(); });
}

int TSprigStructureNode::GetChildCount() { return FSprig ? FSprig->Count() : 0; }

IPtr<IOTAStructureNode> TSprigStructureNode::GetChild(int AIndex) {
  return Shielded(IPtr<IOTAStructureNode>(), [&] {
    return FSprig && AIndex >= 0 && AIndex < FSprig->Count() ? StructureNodeFor(FSprig->Items(AIndex))
                                                              : IPtr<IOTAStructureNode>();
  });
}

TOTABool TSprigStructureNode::GetExpanded() { return ToOTABool(FSprig && FSprig->Expanded()); }

void TSprigStructureNode::SetExpanded(TOTABool AValue) {
  if (FSprig) FSprig->SetExpanded(AValue != OTAFalse);
}

String TSprigStructureNode::GetHint() {
  return Shielded(String(), [this] { return FSprig ? FSprig->Hint() : String(); });
}

int TSprigStructureNode::GetImageIndex() {
  return Shielded(-1, [this] { return FSprig && GImageOffset >= 0 ? FSprig->GetImageIndex() + GImageOffset : -1; });
}

String TSprigStructureNode::GetName() {
  return Shielded(String(), [this] { return FSprig ? FSprig->Name() : String(); });
}

int TSprigStructureNode::GetStateIndex() {
  return Shielded(-1, [this] {
    const int State = FSprig ? FSprig->GetStateIndex() : 0;
    return State == 0 || GStateImageOffset == -1 ? -1 : State + GStateImageOffset;
  });
}

TOTABool TSprigStructureNode::GetSortByIndex() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FSprig && FSprig->SortByIndex()); });
}

int TSprigStructureNode::GetItemIndex() {
  return Shielded(-1, [this] { return FSprig ? FSprig->ItemIndex() : -1; });
}

IPtr<IOTAStructureNode> TRootSprigStructureNode::GetParent() {
  return Shielded(IPtr<IOTAStructureNode>(), [this] {
    auto* Root = dynamic_cast<TRootSprig*>(GetSprig());
    IPtr<IOTAStructureContext110> Context = QueryAs<IOTAStructureContext110>(StructureContextFor(Root));
    return Context ? Context->GetRootStructureNode(0) : IPtr<IOTAStructureNode>();
  });
}

IPtr<IOTAStructureNode> StructureNodeFor(TSprig* ASprig) {
  if (!ASprig || ASprig->Invalid()) return nullptr;
  if (!ASprig->StructureNode()) {
    IPtr<IOTAStructureNode> Node =
        ASprig->Root() == ASprig ? InterfaceOf<IOTAStructureNode>(New<TRootSprigStructureNode>(ASprig).Get())
                                 : InterfaceOf<IOTAStructureNode>(New<TSprigStructureNode>(ASprig).Get());
    ASprig->SetStructureNode(Node);
  }
  return ASprig->StructureNode();
}

//===----------------------------------------------------------------------===//
// The context: identity and top nodes
//===----------------------------------------------------------------------===//

TRootSprigStructureContext::TRootSprigStructureContext(TRootSprig* ARootSprig)
    : TSprigStructureNode(ARootSprig), FRootSprig(ARootSprig) {}

void TRootSprigStructureContext::ClearSprig() noexcept {
  inherited::ClearSprig();
  if (!FRootSprig) return;
  FRootSprig = nullptr;
  RunIgnoringExceptions([this] { UnregisterDesignNotification(InterfaceOf<IDesignNotification>(this)); });
}

IPtr<IDesigner> TRootSprigStructureContext::RootDesigner() const {
  IPtr<IDesigner> Designer;
  if (FRootSprig) FRootSprig->GetDesigner(Designer);
  return Designer;
}

IPtr<IOTAStructureNode> TRootSprigStructureContext::GetChild(int AIndex) {
  return Shielded(IPtr<IOTAStructureNode>(),
                  [&] { return AIndex == 0 && FRootSprig ? StructureNodeFor(FRootSprig) : IPtr<IOTAStructureNode>(); });
}

String TRootSprigStructureContext::GetContextIdent() {
  return Shielded(String(), [this] { return FRootSprig ? FRootSprig->Name() : String(); });
}

String TRootSprigStructureContext::GetStructureType() { return "Designer.StructureType"; }

IPtr<IOTAStructureNode> TRootSprigStructureContext::GetRootStructureNode(int) {
  return Shielded(IPtr<IOTAStructureNode>(), [this] {
    if (!FRootSprig) return IPtr<IOTAStructureNode>();
    if (FRootSprig->RepopulateNeeded()) FRootSprig->Repopulate();
    return InterfaceOf<IOTAStructureNode>(static_cast<TSprigStructureNode*>(this));
  });
}

TOTABool TRootSprigStructureContext::SameContext(const IPtr<IOTAStructureContext>& AContext) {
  return ToOTABool(AContext && SameObject<IOTAStructureContext>(AContext.Get(), this));
}

void TRootSprigStructureContext::DefaultNodeAction(const IPtr<IOTAStructureNode>& ANode) {
  RunIgnoringExceptions([&] {
    IPtr<IOTAStructureView> V = View();
    TSprig* Sprig = SprigOf(ANode);
    if (!V || !Sprig || !FRootSprig || V->GetSelectedCount() != 1) return;
    if (!SameObject(V->GetFirstSelected().Get(), ANode.Get())) return;
    auto* Component = dynamic_cast<TComponent*>(Sprig->Item());
    if (IPtr<IDesigner> Designer = RootDesigner(); Component && Designer) Designer->Edit(Component);
  });
}

//===----------------------------------------------------------------------===//
// The popup menu
//===----------------------------------------------------------------------===//

void TRootSprigStructureContext::InitPopupMenu(const IPtr<IOTAStructureNode>& ANode,
                                               const IPtr<IOTAStructureNodeMenuItem>& AMenu) {
  RunIgnoringExceptions([&] { DoInitPopupMenu(ANode, AMenu); });
}

void TRootSprigStructureContext::DoInitPopupMenu(const IPtr<IOTAStructureNode>& ANode,
                                                 const IPtr<IOTAStructureNodeMenuItem>& AMenu) {
  if (!AMenu || !QueryAs<ISprig>(ANode) || !View() || !FRootSprig) return;
  IPtr<IDesignLocalMenu> LocalMenu = QueryAs<IDesignLocalMenu>(FindRootDesigner(FRootSprig->Item()));
  if (!LocalMenu) return;
  TSprig* Sprig = SprigOf(ANode);
  TLocalMenuTypes Kinds;
  if (Sprig && Sprig->ShowRegisteredMenus()) Kinds = {lmModule, lmSelection, lmComponent};
  IPtr<IPopupMenu> Popup = LocalMenu->BuildLocalMenu(Kinds);
  if (!Popup) return;
  IPtr<IMenuItem> Items = Popup->GetItems();
  if (Sprig) AddSprigEntries(Sprig, Items);
  if (Items->GetCount() > 0 && AMenu->Get_Count() > 0) Items->InsertLine(0, "");
  for (int I = Items->GetCount() - 1; I >= 0; --I) AMenu->InsertItem(0, TreeIntf::WrapMenuItem(Items->GetItem(I)));
  FLastPopup = Popup;
}

void TRootSprigStructureContext::AddSprigEntries(TSprig* Sprig, const IPtr<IMenuItem>& Items) {
  Sprig->PrepareMenu(IPtr<IMenuItems>(Items));
  int Types = Sprig->AddTypeCount();
  if (Types <= 0) return;
  Items->InsertLine(0, "");
  TNotifyEvent OnAdd = TNotifyEvent::Bind<&TRootSprigStructureContext::HandleAddType>(this);
  for (int I = Types - 1; I >= 0; --I) Items->InsertItem(0, Sprig->GetAddType(I), "", OnAdd, I);
}

void TRootSprigStructureContext::HandleAddType(TObject* ASender) {
  auto* Entry = dynamic_cast<TComponent*>(ASender);
  if (Entry && FRootSprig) FRootSprig->AddType(Entry->Tag());
}

//===----------------------------------------------------------------------===//
// The selection, both ways
//===----------------------------------------------------------------------===//

void TRootSprigStructureContext::NodeSelected(const IPtr<IOTAStructureNode>&) {
  if (SelectLocked() || !FRootSprig) return;
  LockSelect();
  auto Unlock = Finally([this]() noexcept { UnlockSelect(); });
  RunIgnoringExceptions([this] { DoNodeSelected(); });
}

void TRootSprigStructureContext::DoNodeSelected() {
  IPtr<IOTAStructureView> V = View();
  if (!V || ViewBusy(V)) return;
  if (V->GetSelectedCount() == 0) {
    FPendingClearSelection = true; // perhaps only a passing state of the view
    return;
  }
  FPendingClearSelection = false;
  IPtr<IDesignerSelections> Wanted = NewSelections();
  for (IPtr<IOTAStructureNode> Node = V->GetFirstSelected(); Node; Node = V->GetNextSelected(Node))
    if (TSprig* Sprig = SprigOf(Node); Sprig && Sprig->Item()) Wanted->Add(Sprig->Item());
  IPtr<IDesigner> Designer = RootDesigner();
  if (!Designer) return;
  IPtr<IDesignerSelections> Current = NewSelections();
  Designer->GetSelections(Current);
  if (SameSelection(Current, Wanted)) return;
  if (Wanted->GetCount() == 0) Designer->NoSelection();
  else Designer->SetSelections(Wanted);
}

void TRootSprigStructureContext::Idle() noexcept {
  if (!FPendingClearSelection) return;
  FPendingClearSelection = false;
  RunIgnoringExceptions([this] {
    IPtr<IOTAStructureView> V = View();
    if (!V || ViewBusy(V) || !FRootSprig || V->GetSelectedCount() != 0) return;
    if (IPtr<IDesigner> Designer = RootDesigner()) Designer->NoSelection();
  });
}

void TRootSprigStructureContext::SelectionChanged(const IPtr<IDesigner>& ADesigner,
                                                  const IPtr<IDesignerSelections>& ASelection) {
  RunIgnoringExceptions([&] { DoSelectionChanged(ADesigner, ASelection); });
}

void TRootSprigStructureContext::DoSelectionChanged(const IPtr<IDesigner>& ADesigner,
                                                    const IPtr<IDesignerSelections>& ASelection) {
  if (SelectLocked() || !ADesigner || !FRootSprig) return;
  if (!SameObject(ADesigner.Get(), RootDesigner().Get())) return;
  IPtr<IOTAStructureView> V = View();
  if (!V) return;
  IPtr<IOTAStructureContext110> Shown = QueryAs<IOTAStructureContext110>(V->GetCurrentContext());
  if (!Shown || Shown->SameContext(InterfaceOf<IOTAStructureContext>(this)) == OTAFalse) return;
  FPendingClearSelection = false;
  LockSelect();
  TRootSprig* Root = FRootSprig;
  Root->BeginUpdate();
  auto Release = Finally([this, Root]() noexcept {
    RunIgnoringExceptions([Root] { Root->EndUpdate(); });
    UnlockSelect();
  });
  if (!ASelection || ASelection->GetCount() == 0) return;
  if (IPtr<IOTAStructureView290> Clearing = QueryAs<IOTAStructureView290>(V)) Clearing->ClearSelection();
  Root->Repopulate();
  for (int I = 0; I < ASelection->GetCount(); ++I) {
    TSprig* Sprig = Root->Find(ASelection->Get(I), true);
    if (!Sprig || Sprig->Invalid()) continue;
    if (IPtr<IOTAStructureNode> Node = StructureNodeFor(Sprig)) V->SelectNode(Node);
  }
}

void TRootSprigStructureContext::ContextActivated() {
  FPendingClearSelection = false;
  RunIgnoringExceptions([this] {
    IPtr<IDesigner> Designer = RootDesigner();
    if (!Designer) return;
    IPtr<IDesignerSelections> Current = NewSelections();
    Designer->GetSelections(Current);
    DoSelectionChanged(Designer, Current);
  });
}

void TRootSprigStructureContext::StructureChanged(const IPtr<IDesigner>& ADesigner) noexcept {
  RunIgnoringExceptions([&] {
    if (!FRootSprig || !ADesigner || !SameObject(ADesigner.Get(), RootDesigner().Get())) return;
    IPtr<IOTAStructureView> V = View();
    if (!V) return;
    FEditStateDirty = true;
    V->StructureChanged(true);
  });
}

//===----------------------------------------------------------------------===//
// Toolbar, keys and edit commands
//===----------------------------------------------------------------------===//

String TRootSprigStructureContext::GetButtonCaption(int AIndex) {
  static const char* const Captions[5] = {"Add", "Delete", "", "Up", "Down"};
  return AIndex >= 0 && AIndex < 5 ? String(Captions[AIndex]) : String();
}

String TRootSprigStructureContext::GetButtonHint(int AIndex) {
  static const char* const Hints[5] = {"New Item", "Delete", "", "Move Up", "Move Down"};
  return AIndex >= 0 && AIndex < 5 ? String(Hints[AIndex]) : String();
}

int TRootSprigStructureContext::GetButtonImageIndex(int AIndex) {
  if (GToolButtonImageOffset < 0 || AIndex < 0 || AIndex >= 5) return -1;
  return GToolButtonImageOffset + ButtonImages[AIndex];
}

TOTABool TRootSprigStructureContext::GetButtonEnabled(int AIndex) {
  return Shielded(OTAFalse, [&] {
    if (!FRootSprig) return OTAFalse;
    switch (AIndex) {
    case 0: return ToOTABool(FRootSprig->CanAdd());
    case 1: return ToOTABool(FRootSprig->GetEditState().Contains(esCanDelete));
    case 3: return ToOTABool(FRootSprig->CanMove(true));
    case 4: return ToOTABool(FRootSprig->CanMove(false));
    default: return OTAFalse;
    }
  });
}

TOTABool TRootSprigStructureContext::GetButtonHasDropDown(int AIndex) {
  return Shielded(OTAFalse, [&] { return ToOTABool(AIndex == 0 && FRootSprig && FRootSprig->AddTypeCount() > 1); });
}

void TRootSprigStructureContext::Invoke(int AIndex) {
  RunIgnoringExceptions([&] { DoInvoke(AIndex); });
}

void TRootSprigStructureContext::DoInvoke(int AIndex) {
  IPtr<IOTAStructureView> V = View();
  if (!FRootSprig || !V) return;
  IPtr<IOTAStructureView290> Updates = QueryAs<IOTAStructureView290>(V);
  if (Updates) Updates->BeginUpdate();
  auto End = Finally([&Updates]() noexcept {
    if (Updates) RunIgnoringExceptions([&Updates] { Updates->EndUpdate(); });
  });
  TRootSprig* Root = FRootSprig;
  switch (AIndex) {
  case 0: Root->AddType(0); break;
  case 1: EditAction(eaDelete); break;
  case 3:
  case 4: {
    // A move re-orders the moved sprig's siblings: it is figured again.
    TSprig* Moved = nullptr;
    Root->SelectedSprig(Moved);
    if (Root->Move(AIndex == 3)) Root->FigureAgain(Moved);
    break;
  }
  default: break;
  }
  if (FRootSprig && FRootSprig->RepopulateNeeded()) V->StructureChanged(false);
}

void TRootSprigStructureContext::KeyDown(const IPtr<IOTAStructureNode>&, std::uint16_t AShift, std::uint16_t& AKey) {
  RunIgnoringExceptions([&] {
    if (AKey != DeleteKey || (AShift & DeleteBlockingShift) != 0) return;
    if (!GetEditState().Contains(esCanDelete)) return;
    EditAction(eaDelete);
    AKey = 0;
  });
}

TOTABool TRootSprigStructureContext::EditAction(TEditAction AAction) {
  return Shielded(OTAFalse, [&] { return ToOTABool(FRootSprig && FRootSprig->EditAction(AAction)); });
}

TEditState TRootSprigStructureContext::GetEditState() {
  if (!FEditStateDirty) return FEditState;
  FEditState = Shielded(TEditState{}, [this] { return FRootSprig ? FRootSprig->GetEditState() : TEditState{}; });
  FEditStateDirty = false;
  return FEditState;
}

//===----------------------------------------------------------------------===//
// Drag and drop
//===----------------------------------------------------------------------===//

TInternalDragSprigs::TInternalDragSprigs() : TStreamAdapter(new TMemoryStream, soOwned) {}

TSprig* TInternalDragSprigs::Sprigs(int AIndex) {
  return AIndex >= 0 && AIndex < Count() ? FDragSprigs[static_cast<std::size_t>(AIndex)] : nullptr;
}

void TInternalDragSprigs::Remove(TSprig* ASprig) { std::erase(FDragSprigs, ASprig); }

TOTAFormatEtc SprigFormatEtc() { return TOTAFormatEtc{GSprigClipboardFormat, OTAAspectContent, OTAMediumStream}; }

namespace {
/// The payload that `ADataObject` carries; null when it carries none.
IPtr<IInternalDragSprigs> PayloadOf(const IPtr<IOTADataObject>& ADataObject) {
  return ADataObject ? QueryAs<IInternalDragSprigs>(ADataObject->GetData(SprigFormatEtc())) : nullptr;
}

/// A new payload with the sprigs of the view's selected nodes, in order, stored in
/// `ADataObject`.
void PutSelectionInto(const IPtr<IOTADataObject>& ADataObject) {
  IPtr<TInternalDragSprigs> Payload = New<TInternalDragSprigs>();
  if (!ADataObject->SetData(SprigFormatEtc(), InterfaceOf<IStream>(Payload.Get()), true)) return;
  IPtr<IOTAStructureView> V = View();
  if (!V) return;
  for (IPtr<IOTAStructureNode> Node = V->GetFirstSelected(); Node; Node = V->GetNextSelected(Node))
    if (TSprig* Sprig = SprigOf(Node)) Payload->Add(Sprig);
}
} // namespace

void TRootSprigStructureContext::DragOver(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject,
                                          TOTADragState AState, int, int, TOTADropMode AMode, int& AEffect,
                                          TOTABool& AAccept) {
  AAccept = OTAFalse;
  RunIgnoringExceptions([&] { DoDragOver(ANode, ADataObject, AState, AMode, AEffect, AAccept); });
}

void TRootSprigStructureContext::DoDragOver(const IPtr<IOTAStructureNode>& ANode,
                                            const IPtr<IInterface>& ADataObject, TOTADragState AState,
                                            TOTADropMode AMode, int& AEffect, TOTABool& AAccept) {
  IPtr<IOTADataObject> Data = QueryAs<IOTADataObject>(ADataObject);
  if (!Data) return;
  if (AState == odsDragEnter && !Data->QueryGetData(SprigFormatEtc())) PutSelectionInto(Data);
  if (AState == odsDragLeave || AMode != odmOnNode) return; // nothing lands between nodes
  IPtr<IInternalDragSprigs> Dragged = PayloadOf(Data);
  TSprig* Target = SprigOf(ANode);
  if (!Dragged || !Target) return;
  bool Accept = true;
  for (int I = 0; I < Dragged->Count() && Accept; ++I) {
    TSprig* Sprig = Dragged->Sprigs(I);
    Accept = !Sprig->Parents(Target) && Target->DragOver(Sprig);
  }
  if (!Accept) return;
  AAccept = OTATrue;
  AEffect = OTADropEffectMove;
}

void TRootSprigStructureContext::DragDrop(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject,
                                          int, int, int, TOTADropMode, int&) {
  RunIgnoringExceptions([&] { DoDragDrop(ANode, ADataObject); });
}

void TRootSprigStructureContext::DoDragDrop(const IPtr<IOTAStructureNode>& ANode,
                                            const IPtr<IInterface>& ADataObject) {
  IPtr<IInternalDragSprigs> Dragged = PayloadOf(QueryAs<IOTADataObject>(ADataObject));
  TSprig* Target = SprigOf(ANode);
  if (!Dragged || !Target || !FRootSprig) return;
  TRootSprig* Root = FRootSprig;
  Root->BeginUpdate();
  auto End = Finally([this, Root]() noexcept {
    FEditStateDirty = true;
    RunIgnoringExceptions([Root] { Root->EndUpdate(); });
  });
  std::vector<TPersistent*> Items;
  bool Dropped = false;
  for (int I = 0; I < Dragged->Count(); ++I) {
    TSprig* Sprig = Dragged->Sprigs(I);
    if (Sprig->Item()) Items.push_back(Sprig->Item());
    Dropped = Target->DragDrop(Sprig) || Dropped;
  }
  if (Dropped) // the dropped sprigs take their new places at the next read
    for (int I = 0; I < Dragged->Count(); ++I) Root->FigureAgain(Dragged->Sprigs(I));
  Root->SelectItems(Items, Dropped);
}

//===----------------------------------------------------------------------===//
// Entry points
//===----------------------------------------------------------------------===//

IPtr<IOTAStructureContext> StructureContextFor(TRootSprig* ARootSprig) {
  if (!ARootSprig) return nullptr;
  if (!ARootSprig->StructureContext()) {
    IPtr<TRootSprigStructureContext> Context = New<TRootSprigStructureContext>(ARootSprig);
    ARootSprig->SetStructureContext(InterfaceOf<IOTAStructureContext>(Context.Get()));
    RegisterDesignNotification(InterfaceOf<IDesignNotification>(Context.Get()));
  }
  return ARootSprig->StructureContext();
}

void InstallStructureViewBridge() {
  RootSprigList()->OnStructureChanged = [](TRootSprig* ARoot, const IPtr<IDesigner>& ADesigner) {
    if (auto* Context = dynamic_cast<TRootSprigStructureContext*>(ARoot->StructureContext().Get()))
      Context->StructureChanged(ADesigner);
  };
}

} // namespace formkit
