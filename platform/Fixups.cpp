//===- platform/Fixups.cpp - Global loading and cross-root references -----===//
//
// A reference to a component of another root is kept as a fixup while that
// root is not loaded: the holder, the property, the root's name and the path
// below it. `GlobalFixupReferences` retries them all whenever roots arrive.
// Every object a fixup names counts it and, when it goes, makes the fixups
// forget it, so no fixup outlives the object it would write into.
//
// Example:
//   BeginGlobalLoading();
//   {
//     auto End = Finally([]() noexcept { EndGlobalLoading(); });
//     Reader->ReadRootComponent(Root);
//     NotifyGlobalLoading();
//   }
//   GetFixupReferenceNames(Root, Names);   // roots still to be opened
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"
#include "platform/Lists.h"

#include <algorithm>
#include <unordered_map>
#include <unordered_set>

namespace formkit {

namespace {

/// Hears of the destruction of the roots that loading lists name.
class TFixupWatcher : public TComponent {
  FK_CLASS(TFixupWatcher, TComponent)
  void Notification(TComponent* AComponent, TOperation Operation) override;
};

/// A reference into a root that is not loaded yet: written into `Prop` of `Instance`
/// (which `Holder` holds, in module `Root`) once `RootName` is found.
struct TGlobalFixup {
  TComponent* Root;
  TPersistent* Instance;
  TComponent* Holder;
  PPropInfo Prop;
  String RootName;
  String Path;
  bool Alive = true;
};

/// The pending global fix-ups. Every object a fix-up names (module, holder, the object
/// written into) counts it, and its teardown makes the fix-ups forget it, so no fix-up
/// outlives what it would write into. Forgotten fix-ups are dropped in bulk, so that
/// adding and forgetting are O(1) amortised.
class TGlobalFixups {
public:
  /// Adds a fix-up; `Instance`, `Holder` and `Root` count it.
  void Add(TGlobalFixup F);
  /// Forgets the fix-up at `Index`.
  void Kill(std::size_t Index) noexcept;
  /// Forgets every fix-up that names `Obj`. Complexity: O(fix-ups naming it).
  void ForgetObject(TPersistent* Obj) noexcept;
  /// Forgets the fix-ups for which `Pred` holds.
  template <class P> void KillIf(P Pred) noexcept {
    for (std::size_t I = 0; I < FList.size(); ++I)
      if (FList[I].Alive && Pred(FList[I])) Kill(I);
  }
  /// The live fix-ups and dead slots, by index; dead ones have `Alive` false.
  std::size_t Size() const noexcept { return FList.size(); }
  const TGlobalFixup& At(std::size_t Index) const noexcept { return FList[Index]; }
  TGlobalFixup& At(std::size_t Index) noexcept { return FList[Index]; }
  /// Drops the dead slots once they are the majority; indices change, so only between walks.
  void Compact();

private:
  template <class F> static void ForEachObject(const TGlobalFixup& Fx, F Fn) {
    Fn(Fx.Root);
    if (Fx.Holder != Fx.Root) Fn(Fx.Holder);
    if (Fx.Instance != Fx.Root && Fx.Instance != Fx.Holder) Fn(Fx.Instance);
  }
  std::vector<TGlobalFixup> FList;
  std::size_t FDead = 0;
  /// For each object a live fix-up names, the indices of fix-ups naming it (some dead).
  std::unordered_map<TPersistent*, std::vector<std::size_t>> FByObject;
};

void TGlobalFixups::Add(TGlobalFixup F) {
  std::size_t Index = FList.size();
  FList.push_back(std::move(F));
  ForEachObject(FList.back(), [&](TPersistent* Obj) {
    if (!Obj) return;
    FByObject[Obj].push_back(Index);
    detail::TPendingReferenceCount::Add(Obj);
  });
}

void TGlobalFixups::Kill(std::size_t Index) noexcept {
  TGlobalFixup& F = FList[Index];
  if (!F.Alive) return;
  F.Alive = false;
  ++FDead;
  ForEachObject(F, [&](TPersistent* Obj) {
    if (!Obj) return;
    detail::TPendingReferenceCount::Drop(Obj);
    if (detail::TPendingReferenceCount::Of(Obj) == 0) FByObject.erase(Obj);
  });
}

void TGlobalFixups::ForgetObject(TPersistent* Obj) noexcept {
  auto It = FByObject.find(Obj);
  if (It == FByObject.end()) return;
  std::vector<std::size_t> Indices = std::move(It->second);
  for (std::size_t I : Indices) Kill(I);
  FByObject.erase(Obj);
}

void TGlobalFixups::Compact() {
  if (FDead * 2 <= FList.size()) return;
  std::vector<TGlobalFixup> Live;
  Live.reserve(FList.size() - FDead);
  for (TGlobalFixup& F : FList)
    if (F.Alive) Live.push_back(std::move(F));
  FList = std::move(Live);
  FDead = 0;
  FByObject.clear();
  for (std::size_t I = 0; I < FList.size(); ++I)
    ForEachObject(FList[I], [&](TPersistent* Obj) {
      if (Obj) FByObject[Obj].push_back(I);
    });
}

/// A component whose `Loaded` waits for the end of the loading bracket, and the root of
/// the read that made it. The root is watched: when it goes, its entries go, without
/// looking at components that may have gone before it.
struct TLoadingEntry {
  TComponent* Component;
  TComponent* ReadRoot;
};

struct TFixupState {
  TGlobalFixups Fixups;
  std::vector<std::vector<TLoadingEntry>> Loading;
  std::vector<std::pair<int, TFindGlobalComponent>> Finders;
  int NextToken = 1;
  TFixupWatcher* Watcher = nullptr; // immortal, like the state
};

TFixupState& State() {
  static auto* S = new TFixupState; // immortal: components may go during process teardown
  return *S;
}

void Watch(TComponent* C) {
  TFixupState& S = State();
  if (!S.Watcher) S.Watcher = CreateComponentOf<TFixupWatcher>(nullptr);
  if (C && C != S.Watcher) S.Watcher->FreeNotification(C);
}

FK_IMPLEMENT(TFixupWatcher, "Classes") {}

void TFixupWatcher::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove) return;
  for (auto& List : State().Loading)
    std::erase_if(List, [&](const TLoadingEntry& E) { return E.Component == AComponent || E.ReadRoot == AComponent; });
}

} // namespace

namespace detail {

void ForgetPendingReferences(TPersistent* Obj) noexcept { State().Fixups.ForgetObject(Obj); }

void AddGlobalFixup(TComponent* Root, TPersistent* Instance, TComponent* Holder, PPropInfo Prop, const String& Path) {
  std::size_t Dot = Path.find('.');
  String RootName = Path.substr(0, Dot);
  String Rest = Dot == String::npos ? String() : Path.substr(Dot + 1);
  TGlobalFixups& Fixups = State().Fixups;
  Fixups.Compact();
  Fixups.Add({Root, Instance, Holder, Prop, std::move(RootName), std::move(Rest)});
}

void SetReferenceProp(TPersistent* Instance, PPropInfo Prop, TComponent* Target) {
  // A component is held through an interface only by its reference wrapper.
  if (Prop->Kind() == tkInterface) SetInterfaceProp(Instance, Prop, IPtr<IInterface>(ComponentReference(Target)));
  else SetObjectProp(Instance, Prop, Target);
}

TComponent* FindReference(TComponent* LookupRoot, const String& Path) {
  if (!LookupRoot || Path.empty()) return nullptr;
  if (TComponent* C = FindNestedComponent(LookupRoot, Path)) return C;
  return SameText(Path, LookupRoot->Name()) ? LookupRoot : nullptr;
}

bool AddGlobalLoaded(const std::vector<TComponent*>& Components) {
  TFixupState& S = State();
  if (S.Loading.empty()) return false;
  auto& List = S.Loading.back();
  for (TComponent* C : Components) List.push_back({C, Components.front()});
  // The root is watched so that a root freed inside the bracket leaves no entries.
  if (!Components.empty()) Watch(Components.front());
  return true;
}

void RemoveGlobalLoaded(const std::vector<TComponent*>& Components) {
  std::unordered_set<TComponent*> Gone(Components.begin(), Components.end());
  for (auto& List : State().Loading)
    std::erase_if(List, [&](const TLoadingEntry& E) { return Gone.count(E.Component) != 0; });
}

} // namespace detail

//===----------------------------------------------------------------------===//
// Global loading
//===----------------------------------------------------------------------===//

void BeginGlobalLoading() { State().Loading.emplace_back(); }

void NotifyGlobalLoading() {
  TFixupState& S = State();
  if (S.Loading.empty()) return;
  std::vector<TLoadingEntry> List = std::move(S.Loading.back());
  S.Loading.back().clear();
  for (const TLoadingEntry& E : List) E.Component->Loaded();
}

void EndGlobalLoading() {
  TFixupState& S = State();
  if (!S.Loading.empty()) S.Loading.pop_back();
}

bool IsGlobalLoading() { return !State().Loading.empty(); }

int RegisterFindGlobalComponentProc(TFindGlobalComponent Proc) {
  TFixupState& S = State();
  int Token = S.NextToken++;
  S.Finders.emplace_back(Token, std::move(Proc));
  return Token;
}

void UnregisterFindGlobalComponentProc(int Token) {
  std::erase_if(State().Finders, [&](const auto& F) { return F.first == Token; });
}

TComponent* FindGlobalComponent(const String& Name) {
  if (Name.empty()) return nullptr;
  TFixupState& S = State();
  // A finder may register or unregister others; walk a copy, the latest first.
  auto Finders = S.Finders;
  for (std::size_t I = Finders.size(); I-- > 0;)
    if (TComponent* C = Finders[I].second(Name)) return C;
  for (std::size_t L = S.Loading.size(); L-- > 0;)
    for (const TLoadingEntry& E : S.Loading[L])
      if (!E.Component->Owner() && SameText(E.Component->Name(), Name)) return E.Component;
  return nullptr;
}

//===----------------------------------------------------------------------===//
// Fixups
//===----------------------------------------------------------------------===//

void GlobalFixupReferences() {
  TGlobalFixups& Fixups = State().Fixups;
  Fixups.Compact();
  // A finder or a setter may add fix-ups (the list grows) or free objects (fix-ups die):
  // walk by index, and copy what is needed before calling out.
  // Many fix-ups name the same few roots: look each name up once a pass.
  std::unordered_map<String, TComponent*> RootsByName;
  for (std::size_t I = 0; I < Fixups.Size(); ++I) {
    if (!Fixups.At(I).Alive) continue;
    String Key = UpperCase(Fixups.At(I).RootName);
    auto Known = RootsByName.find(Key);
    if (Known == RootsByName.end()) Known = RootsByName.emplace(Key, FindGlobalComponent(Fixups.At(I).RootName)).first;
    TComponent* Root = Known->second;
    if (!Root || !Fixups.At(I).Alive) continue;
    const TGlobalFixup& F = Fixups.At(I);
    TComponent* Target = F.Path.empty() ? Root : FindNestedComponent(Root, F.Path);
    if (!Target) continue;
    TPersistent* Instance = F.Instance;
    PPropInfo Prop = F.Prop;
    Fixups.Kill(I);
    try {
      detail::SetReferenceProp(Instance, Prop, Target);
    } catch (const Exception&) {
      // A target of the wrong class cannot be assigned; the reference is dropped.
    }
  }
}

namespace {
/// Calls `Fn` for each live fix-up.
template <class F> void ForEachFixup(F Fn) {
  TGlobalFixups& Fixups = State().Fixups;
  for (std::size_t I = 0; I < Fixups.Size(); ++I)
    if (Fixups.At(I).Alive) Fn(Fixups.At(I));
}
} // namespace

void GetFixupReferenceNames(TComponent* Root, std::vector<String>& Names) {
  ForEachFixup([&](const TGlobalFixup& F) {
    if (F.Root != Root) return;
    bool Known = std::any_of(Names.begin(), Names.end(), [&](const String& N) { return SameText(N, F.RootName); });
    if (!Known) Names.push_back(F.RootName);
  });
}

void GetFixupInstanceNames(TComponent* Root, const String& ReferenceRootName, std::vector<String>& Names) {
  ForEachFixup([&](const TGlobalFixup& F) {
    if (F.Root != Root || !SameText(F.RootName, ReferenceRootName) || F.Path.empty()) return;
    bool Known = std::any_of(Names.begin(), Names.end(), [&](const String& N) { return SameText(N, F.Path); });
    if (!Known) Names.push_back(F.Path);
  });
}

namespace {
void AddMissing(const std::vector<String>& From, TStrings* To) {
  for (const String& S : From)
    if (To->IndexOf(S) < 0) To->Add(S);
}
} // namespace

void GetFixupReferenceNames(TComponent* Root, TStrings* Names) {
  std::vector<String> List;
  GetFixupReferenceNames(Root, List);
  AddMissing(List, Names);
}

void GetFixupInstanceNames(TComponent* Root, const String& ReferenceRootName, TStrings* Names) {
  std::vector<String> List;
  GetFixupInstanceNames(Root, ReferenceRootName, List);
  AddMissing(List, Names);
}

void RedirectFixupReferences(TComponent* Root, const String& OldRootName, const String& NewRootName) {
  TGlobalFixups& Fixups = State().Fixups;
  for (std::size_t I = 0; I < Fixups.Size(); ++I) {
    TGlobalFixup& F = Fixups.At(I);
    if (F.Alive && F.Root == Root && SameText(F.RootName, OldRootName)) F.RootName = NewRootName;
  }
  GlobalFixupReferences();
}

void RemoveFixupReferences(TComponent* Root, const String& RootName) {
  State().Fixups.KillIf([&](const TGlobalFixup& F) {
    return (!Root || F.Root == Root) && (RootName.empty() || SameText(F.RootName, RootName));
  });
}

} // namespace formkit
