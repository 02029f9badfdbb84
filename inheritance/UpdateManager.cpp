//===- inheritance/UpdateManager.cpp - Ancestor changes reach descendants -===//
#include "inheritance/UpdateManager.h"

#include "core/root/ComponentRoot.h"
#include "inheritance/Proxies.h"
#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <optional>
#include <unordered_map>

namespace formkit {

FK_IMPLEMENT(TUpdateManager, "UpdateManager") {}

namespace detail {

//===----------------------------------------------------------------------===//
// Pairing the descendant's tree with the ancestor's, by name under a parent
//===----------------------------------------------------------------------===//

struct TPairing;

/// The pairings of one parent. `Ancestor` tells which side is being added.
struct TPairings {
  std::vector<std::unique_ptr<TPairing>> List;
  bool Ancestor = false;
  bool FHasNew = false;
  TPairing* FPairing = nullptr;

  explicit TPairings(TPairing* Owner) : FPairing(Owner) {}
  void AddChild(TComponent* Child);
  void Clear();

private:
  TPairing* FindWaitingTwin(TComponent* Child);
  TPairing* FindWaitingTwinByName(TComponent* Child);
  void IndexPairing(std::size_t Index);

  /// Where the next twin is likeliest: just after the last one found, since both sides
  /// usually list their children in the same order.
  std::size_t FGuess = 0;
  /// The positions in `List` of the pairings that had one side when indexed, by the
  /// folded hash of that side's name. Built at the first guess that misses, so a parent
  /// whose children come in the same order on both sides never builds it; an entry is
  /// checked before use.
  std::unique_ptr<std::unordered_multimap<std::uint64_t, std::size_t>> FByName;
};

/// One position of the descendant's tree paired with one of the ancestor's; either side
/// may be missing.
struct TPairing {
  TComponent* FComponent = nullptr;
  TComponent* FAncestor = nullptr;
  TComponent* FComponentRoot = nullptr;
  TComponent* FAncestorRoot = nullptr;
  TPairings FChildren{this};
  TPairings* FParent = nullptr;
  bool FNew = false;

  void SetComponent(TComponent* Comp);
  void SetAncestor(TComponent* Comp);
  void MarkNew();

private:
  void SetComponentRoot(TComponent* Root);
  void SetAncestorRoot(TComponent* Root);
  void AddChildren(TComponent* Comp, TComponent* Root, bool Ancestor);
};

bool IsInline(const TComponent* C) { return C && C->ComponentState().Contains(csInline); }

void TPairing::SetComponentRoot(TComponent* Root) {
  FComponentRoot = Root;
  for (auto& Child : FChildren.List) Child->SetComponentRoot(Root);
}

void TPairing::SetAncestorRoot(TComponent* Root) {
  FAncestorRoot = Root;
  for (auto& Child : FChildren.List) Child->SetAncestorRoot(Root);
}

void TPairing::SetComponent(TComponent* Comp) {
  FComponent = Comp;
  if (!FComponentRoot || IsInline(Comp)) SetComponentRoot(Comp);
  AddChildren(Comp, FComponentRoot, false);
}

void TPairing::SetAncestor(TComponent* Comp) {
  FAncestor = Comp;
  if (!FAncestorRoot || IsInline(Comp) || IsInline(FComponent)) SetAncestorRoot(Comp);
  AddChildren(Comp, FAncestorRoot, true);
}

void TPairing::AddChildren(TComponent* Comp, TComponent* Root, bool Ancestor) {
  bool Saved = std::exchange(FChildren.Ancestor, Ancestor);
  auto Restore = Finally([this, Saved]() noexcept { FChildren.Ancestor = Saved; });
  Comp->GetChildren([this](TComponent* Child) { FChildren.AddChild(Child); }, Root);
}

void TPairing::MarkNew() {
  FNew = true;
  for (TPairings* Up = FParent; Up; Up = Up->FPairing->FParent) Up->FHasNew = true;
}

namespace {
/// The side of `P` that waits for a twin from the side being added, or null when `P`
/// already has the added side.
TComponent* WaitingSide(const TPairing& P, bool Ancestor) {
  if (Ancestor) return P.FAncestor ? nullptr : P.FComponent;
  return P.FComponent ? nullptr : P.FAncestor;
}
} // namespace

void TPairings::Clear() {
  List.clear();
  FByName.reset();
  FGuess = 0;
}

void TPairings::IndexPairing(std::size_t Index) {
  const TPairing& P = *List[Index];
  if (P.FComponent && P.FAncestor) return; // a pair is never a twin again
  if (TComponent* Side = P.FComponent ? P.FComponent : P.FAncestor)
    FByName->emplace(FoldedNameHash(Side->Name()), Index);
}

/// The first pairing in list order that has only the other side, of the same name.
TPairing* TPairings::FindWaitingTwin(TComponent* Child) {
  // Names are unique among the children one root owns, so a named hit is the only one.
  if (FGuess < List.size() && !Child->Name().empty()) {
    TComponent* Other = WaitingSide(*List[FGuess], Ancestor);
    if (Other && CompareText(Other->Name(), Child->Name()) == 0) return List[FGuess++].get();
  }
  return FindWaitingTwinByName(Child);
}

TPairing* TPairings::FindWaitingTwinByName(TComponent* Child) {
  if (!FByName) {
    FByName = std::make_unique<std::unordered_multimap<std::uint64_t, std::size_t>>();
    for (std::size_t I = 0; I < List.size(); ++I) IndexPairing(I);
  }
  std::size_t First = List.size();
  auto [Begin, End] = FByName->equal_range(FoldedNameHash(Child->Name()));
  for (auto It = Begin; It != End; ++It) {
    if (It->second >= First) continue;
    TComponent* Other = WaitingSide(*List[It->second], Ancestor);
    if (Other && CompareText(Other->Name(), Child->Name()) == 0) First = It->second;
  }
  if (First == List.size()) return nullptr;
  FGuess = First + 1;
  return List[First].get();
}

void TPairings::AddChild(TComponent* Child) {
  // What the descendant added itself has no twin and takes no part.
  if (!Ancestor && !Child->ComponentState().Contains(csAncestor)) return;
  TPairing* Match = nullptr;
  if (Ancestor ? FPairing->FComponent != nullptr : FPairing->FAncestor != nullptr) Match = FindWaitingTwin(Child);
  if (!Match) {
    List.push_back(std::make_unique<TPairing>());
    Match = List.back().get();
    Match->FParent = this;
    Match->FComponentRoot = FPairing->FComponentRoot;
    Match->FAncestorRoot = FPairing->FAncestorRoot;
  }
  if (Ancestor) Match->SetAncestor(Child);
  else Match->SetComponent(Child);
  if (FByName && Match == List.back().get()) IndexPairing(List.size() - 1);
  if (FPairing->FNew) Match->MarkNew();
}

//===----------------------------------------------------------------------===//
// One update run: what the ancestor dropped goes, what it added comes
//===----------------------------------------------------------------------===//

/// The stream, writer and reader that bring new components over; made at the first new
/// component and shared by all of a run.
class TCreateRun {
public:
  explicit TCreateRun(TUpdateManager& Manager) : FManager(Manager) {}
  ~TCreateRun() {
    if (FReader) RunIgnoringExceptions([this] { FReader->EndReferences(); });
  }
  TCreateRun(const TCreateRun&) = delete;
  TCreateRun& operator=(const TCreateRun&) = delete;

  void DeleteDeleted(TPairing& Pairing);
  void CreateNew(TComponent* Parent, TPairing& Pairing);
  void CreateUpdateObjects(TPairing& Pairing, TUpdateObject* UpdateObject);
  /// Resolves the references the new components hold.
  void Finish() {
    if (FReader) FReader->FixupReferences();
  }

private:
  TComponent* CreateFrom(TComponent* Ancestor, TComponent* Parent);
  TComponent* NewInstance(TComponent* Ancestor, TComponent* Parent);
  void Prepare();
  IPtr<IUpdateManager> AsManager() { return IPtr<IUpdateManager>(static_cast<IUpdateManager*>(&FManager)); }

  TUpdateManager& FManager;
  TObjectGuard<TMemoryStream> FStream;
  TObjectGuard<TWriter> FWriter;
  TObjectGuard<TReader> FReader;
};

void TCreateRun::DeleteDeleted(TPairing& Pairing) {
  if (Pairing.FAncestor) {
    for (auto& Child : Pairing.FChildren.List) DeleteDeleted(*Child);
    return;
  }
  if (!Pairing.FComponent) return;
  if (const auto& Notifier = FManager.Notifier()) Notifier->Deleting(AsManager(), Pairing.FComponent);
  TComponent* Gone = std::exchange(Pairing.FComponent, nullptr);
  Pairing.FChildren.Clear();
  Gone->Destroy();
}

void TCreateRun::CreateNew(TComponent* Parent, TPairing& Pairing) {
  if (Pairing.FAncestor && !Pairing.FComponent) {
    Pairing.MarkNew();
    Pairing.SetComponent(CreateFrom(Pairing.FAncestor, Parent));
  }
  // A pairing list grows while new components are set: walk it by index.
  for (std::size_t I = 0; I < Pairing.FChildren.List.size(); ++I)
    CreateNew(Pairing.FComponent, *Pairing.FChildren.List[I]);
}

void TCreateRun::Prepare() {
  if (FStream) return;
  FStream.Reset(new TMemoryStream);
  FWriter.Reset(new TWriter(FStream.Get(), 256));
  FWriter->SetRoot(FManager.GetAncestor());
  FReader.Reset(new TReader(FStream.Get(), 256));
  FReader->SetRoot(FManager.GetComponent());
  FReader->SetOwner(FManager.GetComponent());
  FReader->BeginReferences();
}

TComponent* TCreateRun::NewInstance(TComponent* Ancestor, TComponent* Parent) {
  // A component inside a nested frame belongs to the frame.
  TComponent* Owner = nullptr;
  for (TComponent* C = Parent; C && !Owner; C = C->GetParentComponent())
    if (IsInline(C)) Owner = C;
  if (!Owner) Owner = FManager.GetComponent();
  TComponent* Instance = nullptr;
  if (const auto& Notifier = FManager.Notifier())
    Instance = Notifier->UpdateManagerCreateComponent(Ancestor->ClassType(), Owner);
  return Instance ? Instance : formkit::CreateComponent(Ancestor->ClassType(), Owner);
}

TComponent* TCreateRun::CreateFrom(TComponent* Ancestor, TComponent* Parent) {
  Prepare();
  const auto& Notifier = FManager.Notifier();
  FWriter->SetPosition(0);
  if (Notifier) Notifier->WriteComponent(FWriter.Get(), Ancestor);
  else FWriter->WriteComponent(Ancestor);
  FWriter->FlushBuffer();
  FReader->SetPosition(0);
  FReader->SetParent(Parent);
  FManager.Updating(Parent);
  TComponent* Instance = NewInstance(Ancestor, Parent);
  auto Free = OnFailure([Instance]() noexcept { Instance->Destroy(); });
  Instance->SetAncestor(true);
  // The stream names the component; an instance handed to the reader keeps its own.
  Instance->SetName(Ancestor->Name());
  TClass Group = Notifier ? Notifier->UpdateManagerClassGroup() : nullptr;
  TClass Previous = Group ? ActivateClassGroup(Group) : nullptr;
  {
    auto Restore = Finally([Previous]() noexcept {
      if (Previous) ActivateClassGroup(Previous);
    });
    FReader->ReadComponent(Instance);
  }
  Instance->GetChildren([this](TComponent* Child) { FManager.SetChildAncestor(Child); }, FManager.GetComponent());
  if (Notifier) Notifier->UpdateManagerComponentCreated(Instance);
  return Instance;
}

/// The direct child of `Owner` that stands for `Component`, or null.
TUpdateObject* DirectChildFor(TUpdateObject* Owner, TComponent* Component) {
  for (TUpdateObject* Child : Owner->Children())
    if (Child->Object() == Component) return Child;
  return nullptr;
}

void TCreateRun::CreateUpdateObjects(TPairing& Pairing, TUpdateObject* UpdateObject) {
  TUpdateObject* Object = nullptr;
  if (Pairing.FNew) {
    // A new parent's update object has already taken in the children it brought along.
    Object = DirectChildFor(UpdateObject, Pairing.FComponent);
    if (!Object)
      Object = new TUpdateObject(UpdateObject, Pairing.FComponent, Pairing.FAncestor, nullptr, true,
                                 IsInline(Pairing.FComponent));
  } else if (Pairing.FChildren.FHasNew) {
    Object = UpdateObject->FindChild(Pairing.FComponent);
  }
  if (!Object || !Pairing.FChildren.FHasNew) return;
  for (auto& Child : Pairing.FChildren.List)
    if (Child->FComponent) CreateUpdateObjects(*Child, Object);
}

/// The names as one comma text: "a,b".
String CommaText(const std::vector<String>& Names) {
  TStringList List;
  for (const String& Name : Names) List.Add(Name);
  return List.CommaText();
}

} // namespace detail

//===----------------------------------------------------------------------===//
// The manager
//===----------------------------------------------------------------------===//

TUpdateManager::TUpdateManager(TComponent* Component, TComponent* Ancestor,
                               const IPtr<IUpdateManager>& AncestorManager,
                               const IPtr<IUpdateManagerCallback>& Notifier)
    : FComponent(Component), FAncestor(Ancestor), FNotifier(Notifier) {
  FParent = ManagerOf(QueryAs<IInterface>(AncestorManager));
  if (FParent) FParent->FChildList.push_back(this);
  auto Leave = OnFailure([this]() noexcept {
    if (FParent) std::erase(FParent->FChildList, this);
  });
  if (FAncestor) FComponentUpdate = std::make_unique<TUpdateObject>(nullptr, Component, Ancestor, nullptr, true, true);
}

void TUpdateManager::BeforeDestruction() {
  // The ancestor goes with its manager: what a descendant tracked of it goes too, and the
  // descendant stays usable on its own.
  for (TUpdateManager* Child : FChildList) {
    Child->FParent = nullptr;
    if (Child->FAncestor == FComponent) {
      Child->FComponentUpdate.reset();
      Child->FAncestor = nullptr;
    }
  }
  FChildList.clear();
  if (FParent) std::erase(FParent->FChildList, this);
  FParent = nullptr;
  FComponentUpdate.reset();
  FUpdateList.clear();
  FNotifier = nullptr;
  inherited::BeforeDestruction();
}

void TUpdateManager::JoinAncestor(TComponent* Ancestor, const IPtr<IUpdateManager>& AncestorManager) {
  TUpdateManager* Parent = ManagerOf(QueryAs<IInterface>(AncestorManager));
  if (FParent || FAncestor || !Parent || !Ancestor) return;
  FComponentUpdate = std::make_unique<TUpdateObject>(nullptr, FComponent, Ancestor, nullptr, true, true);
  FAncestor = Ancestor;
  FParent = Parent;
  FParent->FChildList.push_back(this);
}

TUpdateManager* TUpdateManager::ManagerOf(const IPtr<IInterface>& Manager) {
  IPtr<IImplementation> Impl = QueryAs<IImplementation>(Manager);
  return Impl ? dynamic_cast<TUpdateManager*>(Impl->GetInstance()) : nullptr;
}

IPtr<IUpdateManager> TUpdateManager::AsManager() { return IPtr<IUpdateManager>(static_cast<IUpdateManager*>(this)); }

bool TUpdateManager::EitherSideDestroying() const noexcept {
  auto Going = [](const TComponent* C) { return C && C->ComponentState().Contains(csDestroying); };
  return Going(FComponent) || Going(FAncestor);
}

void TUpdateManager::Modified() {
  Filter();
  UpdateChildren();
}

void TUpdateManager::Filter() {
  if (FMode != umNone || EitherSideDestroying()) return;
  FMode = umFilter;
  auto Reset = Finally([this]() noexcept { FMode = umNone; });
  if (FComponentUpdate) FComponentUpdate->Filter();
}

void TUpdateManager::UpdateChildren() {
  // A descendant may close while its update runs: walk a copy.
  std::vector<TUpdateManager*> Children = FChildList;
  for (TUpdateManager* Child : Children)
    if (std::find(FChildList.begin(), FChildList.end(), Child) != FChildList.end()) Child->Update();
}

void TUpdateManager::BeginUpdate() {
  if (FOnUpdating) FOnUpdating(this);
  if (FNotifier) FNotifier->Updating(AsManager());
}

void TUpdateManager::EndUpdate() {
  if (FOnUpdate) FOnUpdate(this);
  if (FNotifier) FNotifier->Updated(AsManager());
}

void TUpdateManager::Update() {
  if (FMode != umNone || EitherSideDestroying()) return;
  // The components touched are released however the run ends; a failed run passes its
  // own exception on.
  auto ReleaseOnFailure = OnFailure([this]() noexcept { ReleaseUpdated(); });
  {
    FMode = umUpdate;
    FUpdateList.clear();
    auto Reset = Finally([this]() noexcept { FMode = umNone; });
    BeginUpdate();
    auto End = Finally([this]() noexcept { RunIgnoringExceptions([this] { EndUpdate(); }); });
    if (FAncestor) RunUpdate();
    UpdateChildren();
  }
  ReleaseUpdated();
  if (FFirstReleaseError) throw Exception(*std::exchange(FFirstReleaseError, std::nullopt));
}

void TUpdateManager::RunUpdate() {
  {
    detail::TPairing Root;
    Root.SetComponent(FComponent);
    Root.SetAncestor(FAncestor);
    detail::TCreateRun Run(*this);
    Run.DeleteDeleted(Root);
    Run.CreateNew(FComponent, Root);
    Run.Finish();
    if (FComponentUpdate) Run.CreateUpdateObjects(Root, FComponentUpdate.get());
  }
  if (FComponentUpdate) FComponentUpdate->Update(*this);
}

void TUpdateManager::ReleaseUpdated() noexcept {
  FFirstReleaseError.reset();
  std::vector<TComponent*> Touched = std::exchange(FUpdateList, {});
  for (auto It = Touched.rbegin(); It != Touched.rend(); ++It) {
    try {
      (*It)->Updated();
    } catch (const std::exception& E) {
      if (!FFirstReleaseError) FFirstReleaseError = E.what();
    } catch (...) {
      if (!FFirstReleaseError) FFirstReleaseError = String();
    }
  }
}


void TUpdateManager::Updating(TComponent* Component) {
  if (Component->ComponentState().Contains(csUpdating)) return;
  FUpdateList.push_back(Component);
  Component->Updating();
}

void TUpdateManager::SetChildAncestor(TComponent* Child) {
  Child->SetAncestor(true);
  Child->GetChildren([this](TComponent* C) { SetChildAncestor(C); }, FComponent);
}

namespace {
/// Whether `Name` is taken in the module of `Manager` or below it; inherited components
/// count only with `CountTwins`.
bool NameTakenBelow(const TUpdateManager& Manager, const String& Name, bool CountTwins) {
  TComponent* Found = Manager.GetComponent() ? Manager.GetComponent()->FindComponent(Name) : nullptr;
  if (Found && (CountTwins || !Found->ComponentState().Contains(csAncestor))) return true;
  const std::vector<TUpdateManager*>& Children = Manager.Children();
  return std::any_of(Children.begin(), Children.end(),
                     [&](const TUpdateManager* C) { return NameTakenBelow(*C, Name, CountTwins); });
}
} // namespace

bool TUpdateManager::NameExists(const String& Name) const {
  if (FComponent && FComponent->FindComponent(Name)) return true;
  // While this module follows its ancestor, the inherited components of its descendants
  // have yet to follow: one that the ancestor moved to another parent is made again here
  // under its old name while the descendants still hold the twin that will go.
  bool CountTwins = FMode != umUpdate;
  return std::any_of(FChildList.begin(), FChildList.end(),
                     [&](const TUpdateManager* C) { return NameTakenBelow(*C, Name, CountTwins); });
}

void TUpdateManager::RenameComponent(const String& CurName, const String& NewName) {
  TComponent* Component = FComponent ? FComponent->FindComponent(CurName) : nullptr;
  if (Component && Component->ComponentState().Contains(csAncestor)) {
    BeginUpdate();
    auto End = Finally([this]() noexcept { RunIgnoringExceptions([this] { EndUpdate(); }); });
    Component->SetName(NewName);
  }
  RenameDescendents(CurName, NewName);
}

void TUpdateManager::RenameDescendents(const String& CurName, const String& NewName) {
  std::vector<TUpdateManager*> Children = FChildList;
  for (TUpdateManager* Child : Children) Child->RenameComponent(CurName, NewName);
}

bool TUpdateManager::CanRevert(TPersistent* Instance, PPropInfo PropInfo) {
  if (!FComponentUpdate) return false;
  bool Continue = true;
  return FComponentUpdate->CanRevert(Instance, PropInfo, Continue);
}

void TUpdateManager::Revert(TPersistent* Instance, PPropInfo PropInfo) {
  if (FAncestor && FComponentUpdate && FComponentUpdate->Revert(Instance, PropInfo)) Update();
}

void TUpdateManager::Notification(TPersistent* Instance, TOperation Operation) {
  auto* Component = dynamic_cast<TComponent*>(Instance);
  if (Operation != opRemove || !Component || !FComponentUpdate) return;
  // The root of the tree frees itself when its own component goes.
  if (FComponentUpdate->ComponentDelete(Component)) (void)FComponentUpdate.release();
}

//===----------------------------------------------------------------------===//
// Inheriting from a module
//===----------------------------------------------------------------------===//

void ValidateInheritence(TComponentRoot& Root, TComponent* Ancestor) {
  std::vector<String> NotInheritable;
  for (int I = 0; I < Ancestor->ComponentCount(); ++I)
    if (!Ancestor->Components(I)->ComponentStyle().Contains(csInheritable))
      NotInheritable.push_back(Ancestor->Components(I)->Name());
  if (NotInheritable.size() == 1)
    throw EComponentDesignerException(sCannotInheritFrom, Ancestor->Name(), NotInheritable.front());
  if (NotInheritable.size() > 1)
    throw EComponentDesignerException(sCannotInheritFroms, Ancestor->Name(), detail::CommaText(NotInheritable));
  for (int I = 0; I < Ancestor->ComponentCount(); ++I) {
    TComponent* C = Ancestor->Components(I);
    if (!C->Name().empty()) continue;
    if (Root.GetMasterView()) throw EComponentDesignerException(sBlankNameMultiview, Ancestor->Name(), C->ClassName());
    throw EComponentDesignerException(sBlankName, Ancestor->Name());
  }
}

void InheritFrom(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor) {
  ValidateInheritence(Root, Ancestor);
  TComponent* Instance = Root.Root();
  CreateSubClass(Instance, ClassName, Root.GetModule() ? Root.GetModule()->GetUnitName() : String(),
                 Ancestor->ClassType());
  // The descendant starts as a full image of its ancestor, read with the module's own
  // hooks: nested frames and handlers find their classes and methods.
  TObjectGuard<TMemoryStream> Image(new TMemoryStream);
  {
    TObjectGuard<TWriter> Writer(new TWriter(Image.Get(), 4096));
    Writer->OnFindAncestor = TFindAncestorEvent::Bind<&TComponentRoot::WriterFindAncestor>(&Root);
    Writer->WriteDescendent(Ancestor, nullptr);
  } // the writer flushes as it goes
  Image->SetPosition(0);
  Root.ReadObjectFromStream(Instance, Image.Get());
  // Everything the image brought has a twin in the ancestor.
  for (int I = 0; I < Instance->ComponentCount(); ++I) Instance->Components(I)->SetAncestor(true);
}

//===----------------------------------------------------------------------===//
// The root's side
//===----------------------------------------------------------------------===//

namespace detail {

/// A module on design as its managers see it. Holds the root by pointer: the root holds
/// its managers, which go before it.
class TRootUpdateCallback : public TInterfacedObject, public IUpdateManagerCallback {
  FK_CLASS(TRootUpdateCallback, TInterfacedObject)
  FK_INTERFACES(IUpdateManagerCallback)
  TRootUpdateCallback() = default;
  explicit TRootUpdateCallback(TComponentRoot* Root) : FRoot(Root) {}

  void Updating(const IPtr<IUpdateManager>& Manager) override { FRoot->Updating(Manager); }
  void Updated(const IPtr<IUpdateManager>& Manager) override { FRoot->Updated(Manager); }
  void Deleting(const IPtr<IUpdateManager>&, TPersistent* Instance) override {
    IPtr<IGrabHandles> Handles = FRoot->Surface() ? FRoot->Surface()->GetGrabHandles() : nullptr;
    IPtr<IItem> Item = Handles ? Handles->GetAttachedItem() : nullptr;
    if (!Item) return;
    IPtr<IItem> Parent = Item->GetParent();
    if (ExtractPersistent(Item) == Instance || (Parent && ExtractPersistent(Parent) == Instance))
      Handles->AttachHandles(nullptr);
  }
  TComponent* UpdateManagerCreateComponent(TClass ComponentClass, TComponent* Owner) override {
    return FRoot->FrameCreateComponent(ComponentClass, Owner);
  }
  void WriteComponent(TWriter* Writer, TComponent* Component) override { Writer->WriteComponent(Component); }
  // The surface takes new components in when the run ends (`Updated`).
  void UpdateManagerComponentCreated(TComponent*) override {}
  TClass UpdateManagerClassGroup() override { return FRoot->Root() ? ClassGroupOf(FRoot->Root()) : nullptr; }

private:
  TComponentRoot* FRoot = nullptr;
};

FK_IMPLEMENT(TRootUpdateCallback, "UpdateManager") {}

/// The manager behind `M`, or null for a manager of another kind: that one joins the
/// root core through hooks of its own, and these leave it alone.
TUpdateManager* Manager(const IPtr<IUpdateManager>& M) { return TUpdateManager::ManagerOf(QueryAs<IInterface>(M)); }

} // namespace detail

IPtr<IUpdateManagerCallback> NewRootUpdateCallback(TComponentRoot& Root) {
  return NewAs<IUpdateManagerCallback, detail::TRootUpdateCallback>(&Root);
}

void InstallUpdateManagerHooks() {
  using detail::Manager;
  TRootHooks::CreateUpdateManager = [](TComponentRoot& Root, TComponent* Component, TComponent* Ancestor,
                                       const IPtr<IUpdateManager>& AncestorManager) {
    return NewAs<IUpdateManager, TUpdateManager>(Component, Ancestor, AncestorManager, NewRootUpdateCallback(Root));
  };
  TRootHooks::UpdateManagerJoinAncestor = [](const IPtr<IUpdateManager>& M, TComponent* Ancestor,
                                             const IPtr<IUpdateManager>& AncestorManager) {
    if (TUpdateManager* Found = Manager(M)) Found->JoinAncestor(Ancestor, AncestorManager);
  };
  TRootHooks::UpdateManagerModified = [](const IPtr<IUpdateManager>& M) {
    if (TUpdateManager* Found = Manager(M)) Found->Modified();
  };
  TRootHooks::UpdateManagerUpdate = [](const IPtr<IUpdateManager>& M) {
    if (TUpdateManager* Manager = TUpdateManager::ManagerOf(QueryAs<IInterface>(M))) Manager->Update();
  };
  TRootHooks::UpdateManagerRemoved = [](const IPtr<IUpdateManager>& M, TPersistent* Instance) {
    if (TUpdateManager* Found = Manager(M)) Found->Notification(Instance, opRemove);
  };
  TRootHooks::UpdateManagerNameExists = [](const IPtr<IUpdateManager>& M, const String& Name) {
    TUpdateManager* Found = Manager(M);
    return Found && Found->NameExists(Name);
  };
  TRootHooks::UpdateManagerComponent = [](const IPtr<IUpdateManager>& M) -> TComponent* {
    TUpdateManager* Found = Manager(M);
    return Found ? Found->GetComponent() : nullptr;
  };
  TRootHooks::UpdateManagerRenameDescendents = [](const IPtr<IUpdateManager>& M, const String& Cur,
                                                  const String& New) {
    if (TUpdateManager* Found = Manager(M)) Found->RenameDescendents(Cur, New);
  };
  TRootHooks::UpdateManagerCanRevert = [](const IPtr<IUpdateManager>& M, TPersistent* Instance, PPropInfo Prop) {
    TUpdateManager* Found = Manager(M);
    return Found && Found->CanRevert(Instance, Prop);
  };
  TRootHooks::UpdateManagerRevert = [](const IPtr<IUpdateManager>& M, TPersistent* Instance, PPropInfo Prop) {
    if (TUpdateManager* Found = Manager(M)) Found->Revert(Instance, Prop);
  };
  TRootHooks::ValidateInheritence = [](TComponentRoot& Root, TComponent* Ancestor) {
    ValidateInheritence(Root, Ancestor);
  };
  TRootHooks::InheritFrom = [](TComponentRoot& Root, const String& ClassName, TComponent* Ancestor) {
    InheritFrom(Root, ClassName, Ancestor);
  };
}

void RemoveUpdateManagerHooks() {
  TRootHooks::CreateUpdateManager = nullptr;
  TRootHooks::UpdateManagerJoinAncestor = nullptr;
  TRootHooks::UpdateManagerModified = nullptr;
  TRootHooks::UpdateManagerUpdate = nullptr;
  TRootHooks::UpdateManagerRemoved = nullptr;
  TRootHooks::UpdateManagerNameExists = nullptr;
  TRootHooks::UpdateManagerComponent = nullptr;
  TRootHooks::UpdateManagerRenameDescendents = nullptr;
  TRootHooks::UpdateManagerCanRevert = nullptr;
  TRootHooks::UpdateManagerRevert = nullptr;
  TRootHooks::ValidateInheritence = nullptr;
  TRootHooks::InheritFrom = nullptr;
}

} // namespace formkit
