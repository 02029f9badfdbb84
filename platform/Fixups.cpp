//===- platform/Fixups.cpp - Global loading and cross-root references -----===//
//
// A reference to a component of another root is kept as a fixup while that
// root is not loaded: the holder, the property, the root's name and the path
// below it. `GlobalFixupReferences` retries them all whenever roots arrive. A
// hidden watcher component asks to be told when a holder or root goes, so no
// fixup outlives the object it would write into.
//
// Example:
//   BeginGlobalLoading();
//   try { Reader->ReadRootComponent(Root); NotifyGlobalLoading(); } catch (...) {
//     EndGlobalLoading(); throw; }
//   EndGlobalLoading();
//   GetFixupReferenceNames(Root, Names);   // roots still to be opened
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"
#include "platform/Lists.h"

#include <algorithm>

namespace formkit {

namespace detail {

/// Hears of the destruction of the components that fixups and loading lists name.
class TFixupWatcher : public TComponent {
  FK_CLASS(TFixupWatcher, TComponent)
  void Notification(TComponent* AComponent, TOperation Operation) override;
};

} // namespace detail

namespace {

struct TGlobalFixup {
  TComponent* Root;
  TPersistent* Instance;
  TComponent* Holder;
  PPropInfo Prop;
  String RootName;
  String Path;
};

struct TFixupState {
  std::vector<TGlobalFixup> Fixups;
  std::vector<std::vector<TComponent*>> Loading;
  std::vector<std::pair<int, TFindGlobalComponent>> Finders;
  int NextToken = 1;
  detail::TFixupWatcher* Watcher = nullptr;
};

TFixupState& State() {
  static auto* S = new TFixupState; // immortal: components may go during process teardown
  return *S;
}

void Watch(TComponent* C) {
  TFixupState& S = State();
  if (!S.Watcher) S.Watcher = static_cast<detail::TFixupWatcher*>(CreateComponent(detail::TFixupWatcher::StaticClass(), nullptr));
  if (C && C != S.Watcher) S.Watcher->FreeNotification(C);
}

bool IsOwnedBy(TComponent* C, TComponent* Owner) {
  for (TComponent* O = C; O; O = O->Owner())
    if (O == Owner) return true;
  return false;
}

} // namespace

namespace detail {

FK_IMPLEMENT(TFixupWatcher, "Classes") {}

void TFixupWatcher::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove) return;
  TFixupState& S = State();
  std::erase_if(S.Fixups, [&](const TGlobalFixup& F) { return F.Root == AComponent || F.Holder == AComponent; });
  for (auto& List : S.Loading) std::erase_if(List, [&](TComponent* C) { return IsOwnedBy(C, AComponent); });
}

void AddGlobalFixup(TComponent* Root, TPersistent* Instance, TComponent* Holder, PPropInfo Prop, const String& Path) {
  std::size_t Dot = Path.find('.');
  String RootName = Path.substr(0, Dot);
  String Rest = Dot == String::npos ? String() : Path.substr(Dot + 1);
  Watch(Root);
  Watch(Holder);
  State().Fixups.push_back({Root, Instance, Holder, Prop, std::move(RootName), std::move(Rest)});
}

void SetReferenceProp(TPersistent* Instance, PPropInfo Prop, TComponent* Target) {
  if (Prop->Kind() == tkInterface) {
    IPtr<IInterface> I(Target ? static_cast<IInterface*>(Target) : nullptr);
    SetInterfaceProp(Instance, Prop, I);
  } else {
    SetObjectProp(Instance, Prop, Target);
  }
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
  List.insert(List.end(), Components.begin(), Components.end());
  // The root is watched so that a root freed inside the bracket leaves no entries.
  if (!Components.empty()) Watch(Components.front());
  return true;
}

void RemoveGlobalLoaded(const std::vector<TComponent*>& Components) {
  for (auto& List : State().Loading)
    std::erase_if(List, [&](TComponent* C) {
      return std::find(Components.begin(), Components.end(), C) != Components.end();
    });
}

} // namespace detail

//===----------------------------------------------------------------------===//
// Global loading
//===----------------------------------------------------------------------===//

void BeginGlobalLoading() { State().Loading.emplace_back(); }

void NotifyGlobalLoading() {
  TFixupState& S = State();
  if (S.Loading.empty()) return;
  std::vector<TComponent*> List = std::move(S.Loading.back());
  S.Loading.back().clear();
  for (TComponent* C : List) C->Loaded();
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
    for (TComponent* C : S.Loading[L])
      if (!C->Owner() && SameText(C->Name(), Name)) return C;
  return nullptr;
}

//===----------------------------------------------------------------------===//
// Fixups
//===----------------------------------------------------------------------===//

void GlobalFixupReferences() {
  TFixupState& S = State();
  for (std::size_t I = 0; I < S.Fixups.size();) {
    const TGlobalFixup& F = S.Fixups[I];
    TComponent* Root = FindGlobalComponent(F.RootName);
    TComponent* Target = Root ? (F.Path.empty() ? Root : FindNestedComponent(Root, F.Path)) : nullptr;
    if (!Target) {
      ++I;
      continue;
    }
    TGlobalFixup Done = F;
    S.Fixups.erase(S.Fixups.begin() + static_cast<std::ptrdiff_t>(I));
    try {
      detail::SetReferenceProp(Done.Instance, Done.Prop, Target);
    } catch (const Exception&) {
      // A target of the wrong class cannot be assigned; the reference is dropped.
    }
  }
}

void GetFixupReferenceNames(TComponent* Root, std::vector<String>& Names) {
  for (const TGlobalFixup& F : State().Fixups) {
    if (F.Root != Root) continue;
    bool Known = std::any_of(Names.begin(), Names.end(), [&](const String& N) { return SameText(N, F.RootName); });
    if (!Known) Names.push_back(F.RootName);
  }
}

void GetFixupInstanceNames(TComponent* Root, const String& ReferenceRootName, std::vector<String>& Names) {
  for (const TGlobalFixup& F : State().Fixups) {
    if (F.Root != Root || !SameText(F.RootName, ReferenceRootName) || F.Path.empty()) continue;
    bool Known = std::any_of(Names.begin(), Names.end(), [&](const String& N) { return SameText(N, F.Path); });
    if (!Known) Names.push_back(F.Path);
  }
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
  for (TGlobalFixup& F : State().Fixups)
    if (F.Root == Root && SameText(F.RootName, OldRootName)) F.RootName = NewRootName;
  GlobalFixupReferences();
}

void RemoveFixupReferences(TComponent* Root, const String& RootName) {
  std::erase_if(State().Fixups, [&](const TGlobalFixup& F) {
    return (!Root || F.Root == Root) && (RootName.empty() || SameText(F.RootName, RootName));
  });
}

} // namespace formkit
