//===- tree/Sprigs.cpp - Informants, sprigs and the simple sprigs --------===//
//
// Links and change notices between informants; a sprig's place in the tree,
// its searches, its text and image, its drag and parenting rules and its life.
//
//===----------------------------------------------------------------------===//
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

#include "platform/ScopeGuard.h"
#include "platform/TypInfo.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TInformant, "TreeIntf") {}
FK_IMPLEMENT(TSprig, "TreeIntf") {}
FK_IMPLEMENT(TSprigTreeNode, "TreeIntf") {}
FK_IMPLEMENT(TAbstractSprig, "TreeIntf") {}
FK_IMPLEMENT(TTransientSprig, "TreeIntf") {}
FK_IMPLEMENT(TTransientCollectionSprig, "TreeIntf") {}
FK_IMPLEMENT(TAbstractCollectionSprig, "TreeIntf") {}
FK_IMPLEMENT(TPersistentSprig, "TreeIntf") {}
FK_IMPLEMENT(TComponentSprig, "TreeIntf") {}
FK_IMPLEMENT(TDragSprigs, "TreeIntf") {}

namespace {
FK_RESOURCESTRING(SNotASprigClass, "%s is not a sprig class");

/// Captions this long or longer are clipped on their way to a node.
constexpr std::size_t CaptionClipLength = 80;
constexpr std::size_t CaptionKeptLength = 76;

const std::vector<TInformant*> NoInformants;
} // namespace

//===----------------------------------------------------------------------===//
// TInformant
//===----------------------------------------------------------------------===//

void TInformant::Notify(TInformant* AInformant) {
  if (!AInformant) return;
  if (!FNotifyList) FNotifyList = std::make_unique<std::vector<TInformant*>>();
  if (std::find(FNotifyList->begin(), FNotifyList->end(), AInformant) != FNotifyList->end()) return;
  FNotifyList->push_back(AInformant);
  AInformant->Notify(this);
}

void TInformant::Unnotify(TInformant* AInformant) {
  if (!FNotifyList) return;
  auto It = std::find(FNotifyList->begin(), FNotifyList->end(), AInformant);
  if (It == FNotifyList->end()) return;
  FNotifyList->erase(It);
  if (FNotifyList->empty()) FNotifyList.reset();
  AInformant->Unnotify(this);
}

void TInformant::EnableNotify() {
  if (FDisableNotify > 0) --FDisableNotify;
  if (FDisableNotify == 0 && FNotifyNeeded) Notification();
}

void TInformant::Notification() {
  if (FDisableNotify != 0 || !FNotifyList) {
    FNotifyNeeded = true;
    return;
  }
  // Backward: `Changed` may unlink, and the list may go with its last entry.
  for (std::size_t I = FNotifyList->size(); I-- > 0;) {
    (*FNotifyList)[I]->Changed(this);
    if (!FNotifyList) break;
    I = std::min(I, FNotifyList->size());
  }
  FNotifyNeeded = false;
}

void TInformant::Changed(TInformant* ASender) {
  if (ASender && ASender->FDestroying) Unnotify(ASender);
}

const std::vector<TInformant*>& TInformant::Linked() const noexcept {
  return FNotifyList ? *FNotifyList : NoInformants;
}

void TInformant::BeginDestruction() {
  if (FDestroying) return;
  FDestroying = true;
  Notification();
}

void TInformant::BeforeDestruction() {
  BeginDestruction();
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// Construction and the children
//===----------------------------------------------------------------------===//

TObjectGuard<TSprig> NewSprig(TSprigClass ASprigClass, TPersistent* AItem) {
  if (!ASprigClass || !ASprigClass->InheritsFrom(TSprig::StaticClass()))
    throw EInvalidOperation(SNotASprigClass, ASprigClass ? ASprigClass->ClassName : String("nil"));
  TObjectGuard<TSprig> Sprig(static_cast<TSprig*>(ASprigClass->NewInstance()));
  Sprig->Create(AItem);
  return Sprig;
}

void TSprig::Create(TPersistent* AItem) {
  FItem = AItem;
  FHidden = FHiddenTested = AItem == nullptr; // an item-less sprig never asks the designer
  SetImageIndex(AItem ? SprigImageItem : SprigImageNone);
  FIconIndex = 0;
  if (AItem) FigureIcon();
}

TSprig* TSprig::Add(TSprig* AItem) {
  if (!AItem || AItem->FParent == this || AItem->Parents(this)) return AItem;
  if (AItem->FParent && AItem->FParent->FList) {
    AItem->ClearTreeNode();
    AItem->FParent->Extract(AItem);
  }
  if (!FList) FList = std::make_unique<std::vector<TSprig*>>();
  std::size_t Pos = FList->size();
  if (SortByIndex()) {
    const int Wanted = AItem->ItemIndex();
    auto It = std::find_if(FList->begin(), FList->end(), [&](TSprig* S) { return S->ItemIndex() >= Wanted; });
    Pos = static_cast<std::size_t>(It - FList->begin());
  }
  FList->insert(FList->begin() + static_cast<std::ptrdiff_t>(Pos), AItem);
  AItem->FParent = this;
  if (!AItem->FRoot && FRoot) {
    AItem->FRoot = FRoot;
    FRoot->AddItem(AItem);
  }
  // A sprig added from outside a repopulation has not been figured: the next one reads
  // the whole module.
  if (FRoot) {
    FRoot->FRepopulateNeeded = true;
    if (!FRoot->FRepopulating) FRoot->FRepopulateAll = true;
  }
  return AItem;
}

void TSprig::Extract(TSprig* AItem) {
  AItem->FParent = nullptr;
  if (!FList) return;
  // While the root validates its own children, the one being validated leaves a hole
  // that the pass closes at its end.
  if (FRoot == this && FRoot->FVisiting >= 0 && FRoot->FVisiting < Count() &&
      (*FList)[static_cast<std::size_t>(FRoot->FVisiting)] == AItem) {
    (*FList)[static_cast<std::size_t>(FRoot->FVisiting)] = nullptr;
    return;
  }
  // From the back: new sprigs are appended, so the one sought is mostly near the end.
  if (auto It = std::find(FList->rbegin(), FList->rend(), AItem); It != FList->rend())
    FList->erase(std::next(It).base());
}

TSprig* TSprig::Items(int Index) const {
  if (!FList) return nullptr;
  return FList->at(static_cast<std::size_t>(Index));
}

int TSprig::Index() const { return FParent ? FParent->IndexOf(this) : -1; }

void TSprig::SetIndex(int Value) {
  if (FParent) FParent->SetIndexOf(this, Value);
}

int TSprig::IndexOf(const TSprig* AItem) const {
  if (!FList) return -1;
  auto It = std::find(FList->begin(), FList->end(), AItem);
  return It == FList->end() ? -1 : static_cast<int>(It - FList->begin());
}

void TSprig::SetIndexOf(TSprig* AItem, int AIndex) {
  const int From = IndexOf(AItem);
  if (From < 0) return;
  const int To = std::clamp(AIndex, 0, Count() - 1);
  FList->erase(FList->begin() + From);
  FList->insert(FList->begin() + To, AItem);
}

bool TSprig::Parents(const TSprig* AItem) const {
  for (const TSprig* S = AItem; S; S = S->FParent)
    if (S == this) return true;
  return false;
}

void TSprig::ForEach(const TSprigAction& ABefore, const TSprigAction& AAfter) {
  if (FInvalid) return;
  if (ABefore) ABefore(this);
  // From the last child: a child that moves elsewhere during its own turn leaves the
  // indexes still to come in place.
  for (int I = Count() - 1; I >= 0; --I)
    if (I < Count()) Items(I)->ForEach(ABefore, AAfter);
  if (AAfter) AAfter(this);
}

//===----------------------------------------------------------------------===//
// Searches
//===----------------------------------------------------------------------===//

TSprig* TSprig::FindItem(TPersistent* AItem, bool ARecurse) {
  if (!AItem) return nullptr;
  if (AItem == FItem) return this;
  for (int I = 0; I < Count(); ++I) {
    TSprig* Child = Items(I);
    if (!Child) continue; // a hole the root's validation pass is about to close
    if (Child->FItem == AItem) return Child;
    if (ARecurse)
      if (TSprig* Found = Child->FindItem(AItem, true)) return Found;
  }
  return nullptr;
}

namespace {
/// Self first, then each child and, with `ARecurse`, its subtree before the next child.
TSprig* SearchTree(TSprig* S, bool ARecurse, const std::function<bool(TSprig*)>& Matches) {
  if (Matches(S)) return S;
  for (int I = 0; I < S->Count(); ++I) {
    TSprig* Child = S->Items(I);
    if (Matches(Child)) return Child;
    if (ARecurse)
      for (int J = 0; J < Child->Count(); ++J)
        if (TSprig* Found = SearchTree(Child->Items(J), true, Matches)) return Found;
  }
  return nullptr;
}
} // namespace

TSprig* TSprig::FindItemByName(const String& AName, TClass AClass, bool ARecurse) {
  if (AName.empty()) return nullptr;
  return SearchTree(this, ARecurse, [&](TSprig* S) {
    return (!AClass || (S->FItem && S->FItem->InheritsFrom(AClass))) && SameText(S->Name(), AName);
  });
}

TSprig* TSprig::FindItemByPath(const String& APath, bool ARecurse) {
  if (APath.empty()) return nullptr;
  return SearchTree(this, ARecurse, [&](TSprig* S) { return SameText(S->Path(), APath); });
}

TSprig* TSprig::SeekParent(TPersistent* AItem, bool ARecurse) {
  if (!AItem) return FRoot;
  if (FParent && FParent->FItem == AItem) return FParent;
  TSprig* Found = Owner() ? Owner()->Find(AItem, ARecurse) : nullptr;
  if (!Found && FRoot) Found = FRoot->Find(AItem, ARecurse);
  if (Found) return Found;
  if (!FRoot) return nullptr;
  TComponent* Component = detail::AsComponent(AItem);
  if (!Component) return FRoot;
  for (TComponent* O = Component->Owner(); O && !Found; O = O->Owner()) Found = FRoot->Find(O, ARecurse);
  return Found && Found->ParentOrphanedSprigs() ? Found : FRoot;
}

TSprig* TSprig::SeekParent(const String& AName, bool ARecurse) {
  if (AName.empty()) return FRoot;
  if (FParent && SameText(FParent->Name(), AName)) return FParent;
  TSprig* Found = Owner() ? Owner()->Find(AName, ARecurse) : nullptr;
  if (!Found && FRoot) Found = FRoot->Find(AName, ARecurse);
  return Found ? Found : FRoot;
}

TSprig* TSprig::SeekParent(const String& AName, TClass AClass, bool ARecurse) {
  if (AName.empty() || !AClass) return FRoot;
  if (FParent && FParent->FItem && FParent->FItem->InheritsFrom(AClass) && SameText(FParent->Name(), AName))
    return FParent;
  if (!Owner()) return FRoot; // this form searches only through an owner
  TSprig* Found = Owner()->Find(AName, AClass, ARecurse);
  if (!Found && FRoot) Found = FRoot->Find(AName, AClass, ARecurse);
  return Found ? Found : FRoot;
}

//===----------------------------------------------------------------------===//
// Text, image and state
//===----------------------------------------------------------------------===//

String TSprig::UniqueName() { return FItem ? FItem->GetNamePath() : String(); }

String TSprig::Path() {
  return FParent ? Format("%s\\%s", FParent->Path(), Name()) : Name();
}

String TSprig::CaptionFor(const String& AName, const String& AReceiver, const String& AClassName) {
  String Text = AName;
  if (!AReceiver.empty()) Text = Format("%s {%s}", Text.empty() ? String("<?>") : Text, AReceiver);
  if (GShowClassNameInTreeView) {
    if (!AClassName.empty()) Text = Format("%s (%s)", Text, AClassName);
    else if (FItem) Text = Format("%s (%s)", Text, FItem->ClassName());
  }
  return Text;
}

String TSprig::Caption() {
  String Text = CaptionFor(Name());
  return IncludeIndexInCaption() ? Format("%d - %s", ItemIndex(), Text) : Text;
}

String ClipSprigCaption(const String& Caption) {
  if (Caption.size() < CaptionClipLength) return Caption;
  return Caption.substr(0, CaptionKeptLength) + "... ";
}

void TSprig::VisualRefresh() {
  if (!FTreeNode) return;
  String Text = Caption();
  if (Text != FCaption) FCaption = ClipSprigCaption(Text);
  FTreeNode->Text = FCaption;
  FTreeNode->ImageIndex = GetImageIndex();
  FTreeNode->SelectedIndex = FTreeNode->ImageIndex;
  FTreeNode->StateIndex = GetStateIndex();
}

int TSprig::GetImageIndex() {
  // The host adds the offset back to reach the class's icon in its list.
  if (FIconIndex >= 1) return FIconIndex - GImageOffset;
  return FImageIndex + (Ghosted() ? SprigImageGhostOffset : 0);
}

PPropInfo TSprig::ParentPropInfo(TClass Class) {
  if (!Class) return nullptr;
  String PropName = ParentProperty();
  if (PropName.empty()) return nullptr;
  return GetPropInfo(Class->TypeInfo(), PropName, TTypeKinds{tkClass});
}

bool TSprig::AnyProblems() {
  if (ParentProperty().empty()) return false;
  PPropInfo Prop = ParentPropInfo(FItem ? FItem->ClassType() : nullptr);
  return !Prop || GetObjectProp(FItem, Prop) == nullptr;
}

bool TSprig::Hidden() {
  IPtr<IDesigner> Designer;
  if (!FHiddenTested && GetDesigner(Designer)) {
    FHiddenTested = true;
    auto* Component = dynamic_cast<TComponent*>(FItem);
    FHidden = Component ? Designer->IsComponentHidden(Component) : true;
  }
  return FHidden;
}

TPersistent* TSprig::FocusItem() {
  if (FItem) return FItem;
  return FParent ? FParent->FocusItem() : nullptr;
}

bool TSprig::CopyGlyph(TObject* ABitmap) { return CopySprigGlyphFunc ? CopySprigGlyphFunc(this, ABitmap) : false; }

//===----------------------------------------------------------------------===//
// Forwarding to the root
//===----------------------------------------------------------------------===//

void TSprig::SelectItems(const std::vector<TPersistent*>& AItems, bool ARuntimeChange) {
  if (FRoot) FRoot->SelectItems(AItems, ARuntimeChange);
}
void TSprig::RuntimeChange() {
  if (FRoot) FRoot->RuntimeChange();
}
void TSprig::DesigntimeChange() {
  if (FRoot) FRoot->DesigntimeChange();
}
bool TSprig::GetDesigner(IPtr<IDesigner>& ADesigner) {
  ADesigner = nullptr;
  return FRoot ? FRoot->GetDesigner(ADesigner) : false;
}
void TSprig::BeginUpdate() {
  if (FRoot) FRoot->BeginUpdate();
}
void TSprig::EnsureUpdate() {
  if (FRoot) FRoot->EnsureUpdate();
}
void TSprig::EndUpdate() {
  if (FRoot) FRoot->EndUpdate();
}

//===----------------------------------------------------------------------===//
// Dragging, moving and making components
//===----------------------------------------------------------------------===//

bool TSprig::DragOverTo(TSprig* AParent) {
  PPropInfo Prop = ParentPropInfo(FItem ? FItem->ClassType() : nullptr);
  if (!Prop || !AParent) return false;
  if (dynamic_cast<TRootSprig*>(AParent)) return true;
  return AParent->FItem && AParent->FItem->InheritsFrom(GetObjectPropClass(Prop));
}

bool TSprig::DragDropTo(TSprig* AParent) {
  if (!AParent || ParentProperty().empty() || AParent == FParent) return false;
  PPropInfo Prop = ParentPropInfo(FItem ? FItem->ClassType() : nullptr);
  if (!Prop) return false;
  SetObjectProp(FItem, Prop, dynamic_cast<TRootSprig*>(AParent) ? nullptr : AParent->FItem);
  return true;
}

bool TSprig::PaletteOver(TSprigClass ASprigClass, TClass AClass) {
  if (!ASprigClass) return false;
  // A class operation: asked of an instance that was never constructed on an item.
  TObjectGuard<TSprig> Prototype(NewSprig(ASprigClass, nullptr));
  return Prototype->PaletteOverTo(this, AClass);
}

bool TSprig::PaletteOverTo(TSprig* AParent, TClass AClass) {
  PPropInfo Prop = ParentPropInfo(AClass);
  if (!Prop || !AParent) return false;
  if (dynamic_cast<TRootSprig*>(AParent)) return true;
  return AParent->FItem && AParent->FItem->InheritsFrom(GetObjectPropClass(Prop));
}

TSprig* TSprig::Neighbour(bool AUp) const {
  if (!FParent) return nullptr;
  const int Here = FParent->IndexOf(this);
  const int There = AUp ? Here - 1 : Here + 1;
  return There >= 0 && There < FParent->Count() ? FParent->Items(There) : nullptr;
}

bool TSprig::CanMove(bool AUp) {
  if (!FParent || !FParent->SortByIndex() || !FStructureNode || !FStructureNode->GetParent()) return false;
  TSprig* Other = Neighbour(AUp);
  return Other && Other->DragOver(this);
}

bool TSprig::Move(bool AUp) {
  BeginUpdate();
  auto End = OnFailure([this]() noexcept { RunIgnoringExceptions([this] { EndUpdate(); }); });
  TSprig* Other = Neighbour(AUp);
  const bool Moved = Other && Other->DragDrop(this);
  if (Moved) SelectItems({FItem}, true);
  End.Dismiss();
  EndUpdate();
  return Moved;
}

void TSprig::SortItems() {
  if (!FList || FList->empty() || !SortByIndex()) return;
  // Insertion sort: stable, and sprigs without items compare equal to everything.
  auto Less = [](TSprig* A, TSprig* B) { return A->FItem && B->FItem && A->ItemIndex() < B->ItemIndex(); };
  std::vector<TSprig*>& L = *FList;
  for (std::size_t I = 1; I < L.size(); ++I)
    for (std::size_t J = I; J > 0 && Less(L[J], L[J - 1]); --J) std::swap(L[J], L[J - 1]);
}

TComponent* TSprig::Construct(TClass AClass) {
  TPersistent* Parent = dynamic_cast<TComponent*>(FItem);
  if (!Parent && Owner()) Parent = Owner()->FItem;
  if (!Parent && FRoot) Parent = FRoot->FItem;
  auto* ParentComponent = dynamic_cast<TComponent*>(Parent);
  IPtr<IDesigner> Designer;
  if (!ParentComponent || !GetDesigner(Designer)) return nullptr;
  return Designer->CreateComponent(AClass, ParentComponent, 0, 0, 0, 0);
}

//===----------------------------------------------------------------------===//
// Parent and children
//===----------------------------------------------------------------------===//

void TSprig::FigureParent() {
  TPersistent* ParentObject = nullptr;
  if (PPropInfo Prop = ParentPropInfo(FItem ? FItem->ClassType() : nullptr))
    ParentObject = dynamic_cast<TPersistent*>(GetObjectProp(FItem, Prop));
  if (!ParentObject)
    if (TComponent* Component = detail::AsComponent(FItem)) ParentObject = Component->GetParentComponent();
  if (ParentObject) {
    if (TSprig* NewParent = SeekParent(ParentObject, true)) NewParent->Add(this);
  } else if (TSprig* O = Owner()) {
    O->Add(this);
  } else if (FRoot) {
    FRoot->Add(this);
  }
}

void TSprig::FigureChildren() {
  if (!FItem || FCollectionsDone) return;
  FCollectionsDone = true;
  FigureCollections();
}

//===----------------------------------------------------------------------===//
// Life
//===----------------------------------------------------------------------===//

void TSprig::Invalidate() {
  if (FInvalid) return;
  FInvalid = true;
  if (FRoot) {
    FRoot->RemoveItem(this);
    // The top of an invalid subtree waits for the next repopulation to free it.
    if (FRoot != this && !IsDestroying() && !(FParent && FParent->FInvalid)) FRoot->NoteInvalid(this);
  }
  FItem = nullptr;
  for (int I = Count() - 1; I >= 0; --I) Items(I)->Invalidate();
}

void TSprig::SetTreeNode(TTreeNode* ANode) noexcept {
  if (FTreeNode) FTreeNode->Data = nullptr;
  FTreeNode = ANode;
  if (ANode) ANode->Data = this;
}

void TSprig::ClearTreeNode(bool ARecurse, bool AFreeNode) {
  EnsureUpdate();
  if (ARecurse)
    for (int I = Count() - 1; I >= 0; --I) Items(I)->ClearTreeNode(true, true);
  if (TTreeNode* Node = std::exchange(FTreeNode, nullptr)) {
    Node->Data = nullptr;
    if (AFreeNode && Node->TreeView() && !Node->TreeView()->IsDestroying()) Node->TreeView()->DeleteNode(Node);
  }
}

void TSprig::ClearUnneededSprigs() {
  for (int I = Count() - 1; I >= 0; --I) {
    TSprig* Child = Items(I);
    Child->ClearUnneededSprigs();
    if ((Child->Transient() && Child->Count() == 0) || Child->FInvalid) Child->Destroy();
  }
}

void TSprig::ReparentChildren() {
  for (int I = Count() - 1; I >= 0; --I) Items(I)->Reparent();
}

void TSprig::SetExpanded(bool AValue) {
  if (AValue == FExpanded) return;
  FExpanded = AValue;
  if (AValue && FParent) FParent->SetExpanded(true);
}

void TSprig::BeforeDestruction() {
  BeginDestruction();
  Invalidate();
  if (FRoot && FRoot != this) FRoot->SprigGone(this);
  FItem = nullptr;
  ClearTreeNode(false, true);
  if (FParent) FParent->Extract(this);
  while (Count() > 0) FList->back()->Destroy(); // each child leaves the list as it goes
  FList.reset();
  FStructureNode = nullptr;
  inherited::BeforeDestruction();
}

void TSprigTreeNode::BeforeDestruction() {
  if (auto* Sprig = static_cast<TSprig*>(Data)) Sprig->ClearTreeNode(true, false);
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// The simple sprigs
//===----------------------------------------------------------------------===//

void TTransientCollectionSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageAbstractCollection);
}

void TAbstractCollectionSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageAbstractCollection);
}

void TComponentSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageComponent);
}

void TComponentSprig::Create(TPersistent* AItem, TSprig* AOwner) {
  Create(AItem);
  FOwner = AOwner;
}

String TComponentSprig::UniqueName() {
  TComponent* Component = detail::AsComponent(Item());
  if (!Component) return inherited::UniqueName();
  if (!Component->Name().empty()) return Component->Name();
  return Format("<Components[%d]>", Component->ComponentIndex());
}

} // namespace formkit
