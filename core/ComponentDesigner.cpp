//===- core/ComponentDesigner.cpp - The base of a framework's designer ---===//
#include "core/ComponentDesigner.h"

#include "core/CustomModules.h"
#include "core/Designers.h"
#include "core/DesignNotifications.h"

namespace formkit {

FK_IMPLEMENT(TComponentDesigner, "ComponentDesigner") {}

namespace {
IInterface* Identity(const IPtr<IRoot>& Root) { return QueryAs<IInterface>(Root).Get(); }
IInterface* Identity(const IPtr<IInternalRoot>& Root) { return QueryAs<IInterface>(Root).Get(); }
} // namespace

TComponentDesigner::TComponentDesigner(const IPtr<IDesignEnvironment>& Environment)
    : FRootList(NewAs<IInterfaceList, TInterfaceList>()), FEnvironment(Environment) {}

void TComponentDesigner::BeforeDestruction() {
  FActiveRoot = nullptr;
  FRootList = nullptr;
  inherited::BeforeDestruction();
}

std::vector<IPtr<IInternalRoot>> TComponentDesigner::Roots() {
  std::vector<IPtr<IInternalRoot>> Out;
  for (int I = 0, N = FRootList->GetCount(); I < N; ++I) Out.push_back(QueryAs<IInternalRoot>(FRootList->Get(I)));
  return Out;
}

IPtr<IRoot> TComponentDesigner::GetRoots(int Index) { return QueryAs<IRoot>(FRootList->Get(Index)); }

//===----------------------------------------------------------------------===//
// Finding roots
//===----------------------------------------------------------------------===//

bool TComponentDesigner::FindFile(const String& Name, IPtr<IRoot>& Root) {
  Root = nullptr;
  for (auto& R : Roots())
    if (R && AnsiCompareFileName(R->GetFileName(), Name) == 0) {
      Root = R;
      return true;
    }
  return false;
}

IPtr<IRoot> TComponentDesigner::FindRoot(TComponent* Component) {
  for (auto& R : Roots())
    if (R && R->GetRoot() == Component) return R;
  IPtr<IRoot> Found;
  if (auto All = Designers())
    All->ForEachDesigner([&](const IPtr<IComponentDesigner>& D) {
      if (QueryAs<IInterface>(D).Get() == QueryAs<IInterface>(Self()).Get()) return true;
      for (int I = 0, N = D->GetRootsCount(); I < N; ++I) {
        IPtr<IRoot> R = D->GetRoots(I);
        if (R && R->GetRoot() == Component) {
          Found = R;
          return false;
        }
      }
      return true;
    });
  return Found;
}

IPtr<IRoot> TComponentDesigner::FindRoot(const String& Name) {
  for (auto& R : Roots())
    if (R && CompareText(R->GetRootName(), Name) == 0) return R;
  IPtr<IRoot> Found;
  if (auto All = Designers())
    All->ForEachDesigner([&](const IPtr<IComponentDesigner>& D) {
      if (QueryAs<IInterface>(D).Get() == QueryAs<IInterface>(Self()).Get()) return true;
      for (int I = 0, N = D->GetRootsCount(); I < N; ++I) {
        IPtr<IRoot> R = D->GetRoots(I);
        if (R && CompareText(R->GetRootName(), Name) == 0) {
          Found = R;
          return false;
        }
      }
      return true;
    });
  return Found;
}

IPtr<IRoot> TComponentDesigner::OpenRootClass(const String& ClassName) {
  String Name = (!ClassName.empty() && (ClassName[0] == 'T' || ClassName[0] == 't')) ? ClassName.substr(1) : ClassName;
  IPtr<IRoot> Root = FindRoot(Name);
  if (!Root && FEnvironment) {
    FEnvironment->OpenModuleByName(Name, nullptr);
    Root = FindRoot(Name);
  }
  if (auto Internal = QueryAs<IInternalRoot>(Root))
    if (Internal->IsDormant()) Internal->Resurrect();
  return Root;
}

void TComponentDesigner::GetRootNames(const TGetStrProc& Proc) {
  for (auto& R : Roots())
    if (R) Proc(R->GetRootName());
}

//===----------------------------------------------------------------------===//
// Selection
//===----------------------------------------------------------------------===//

void TComponentDesigner::SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                                      const IPtr<IDesignerSelections>& Selections) {
  IPtr<IDesignerSelections> NewSelections = (Selections && Selections->GetCount() > 0) ? Selections : nullptr;
  IPtr<IInternalRoot> NewRoot = QueryAs<IInternalRoot>(Designer);
  bool RootChanged = Identity(NewRoot) != Identity(FActiveRoot);
  bool SelectionChanged = (static_cast<bool>(NewSelections) != static_cast<bool>(FSelections)) ||
                          (NewSelections && FSelections && !NewSelections->Equals(FSelections));
  if (RootChanged) {
    if (FActiveRoot) FActiveRoot->SetActive(false);
    if (NewRoot) NewRoot->SetActive(true);
  }
  DesignNotificationSelectionChanged(Designer, NewAs<IDesignerSelections, TDesignerSelections>(NewSelections));
  FActiveRoot = NewRoot;
  FActiveEditHandler = QueryAs<IEditHandler>(Window);
  FSelections = NewSelections;
  if ((RootChanged || SelectionChanged) && FEnvironment) FEnvironment->SelectionChanged();
}

void TComponentDesigner::GetSelection(const IPtr<IDesignerSelections>& List) {
  if (!FSelections || !List) return;
  for (int I = 0, N = FSelections->GetCount(); I < N; ++I) List->Add(FSelections->Get(I));
}

void TComponentDesigner::UpdateSelections() {
  if (FInUpdateSelections) return;
  FInUpdateSelections = true;
  try {
    for (auto& R : Roots()) {
      if (!R || R->IsDormant()) continue;
      IPtr<IDesignerSelections> List = CreateSelectionList();
      R->GetSelections(List);
      SetSelection(QueryAs<IDesigner>(R), nullptr, List);
      break;
    }
  } catch (...) {
    FInUpdateSelections = false;
    throw;
  }
  FInUpdateSelections = false;
}

TClass TComponentDesigner::GetFirstSelectionClass() {
  return (FSelections && FSelections->GetCount() > 0) ? FSelections->Get(0)->ClassType() : nullptr;
}

String TComponentDesigner::GetFirstSelectionType() {
  TClass C = GetFirstSelectionClass();
  return C ? C->ClassName : "";
}

String TComponentDesigner::GetFirstSelectionUnit() {
  TClass C = GetFirstSelectionClass();
  return C ? C->UnitName : "";
}

String TComponentDesigner::GetSelectionName() {
  return (FSelections && FSelections->GetCount() == 1) ? FSelections->Get(0)->GetNamePath() : "";
}

String TComponentDesigner::GetSelectionType() {
  return (FSelections && FSelections->GetCount() == 1) ? FSelections->Get(0)->ClassName() : "";
}

void TComponentDesigner::GetProperties(const TGetPropProc& Proc) {
  if (!FActiveRoot || !FSelections || FSelections->GetCount() == 0) return;
  GetComponentProperties(FSelections, tkAny, QueryAs<IDesigner>(FActiveRoot), Proc);
}

//===----------------------------------------------------------------------===//
// Roots' lifecycle
//===----------------------------------------------------------------------===//

void TComponentDesigner::RootActivated(const IPtr<IRoot>& Root) {
  if (Root) {
    FRootList->Remove(QueryAs<IInterface>(Root));
    FRootList->Insert(0, QueryAs<IInterface>(Root));
    UpdateSelections();
  } else {
    FActiveRoot = nullptr;
  }
  if (FEnvironment) FEnvironment->ActiveRootChanged();
  if (auto All = Designers()) All->ActivateDesigner(Self());
}

void TComponentDesigner::RootModified(const IPtr<IRoot>& Root) {
  if (FActiveRoot && Identity(Root) == Identity(FActiveRoot)) {
    if (EvActiveRootModifiedEvent) EvActiveRootModifiedEvent->Send(this);
    if (FEnvironment) FEnvironment->ActiveRootModified();
  }
  DesignNotificationItemsModified(QueryAs<IDesigner>(Root));
}

void TComponentDesigner::RootGoingDormant(const IPtr<IRoot>& Root) {
  if (FActiveRoot && Identity(Root) == Identity(FActiveRoot)) FActiveRoot = nullptr;
  UpdateSelections();
}

void TComponentDesigner::RootListAdd(const IPtr<IRoot>& Root) { FRootList->Add(QueryAs<IInterface>(Root)); }

void TComponentDesigner::RootListRemove(const IPtr<IRoot>& Root) {
  FRootList->Remove(QueryAs<IInterface>(Root));
  if (FActiveRoot && Identity(Root) == Identity(FActiveRoot)) {
    if (auto All = Designers()) All->RootRemoved(Root);
    FActiveRoot = nullptr;
  }
}

void TComponentDesigner::RemoveDependenciesOn(TComponent* Component) {
  // Roots without an ancestor first: walking from the last, a root with an ancestor is
  // appended, one without is put in front.
  std::vector<IPtr<IInterface>> Scratch;
  for (int I = FRootList->GetCount() - 1; I >= 0; --I) {
    IPtr<IInterface> Entry = FRootList->Get(I);
    auto Root = QueryAs<IInternalRoot>(Entry);
    bool HasAncestor = Root && Root->GetAncestorRoot();
    if (HasAncestor || Scratch.empty()) Scratch.push_back(Entry);
    else Scratch.insert(Scratch.begin(), Entry);
  }
  FRootList->Lock();
  for (size_t I = 0; I < Scratch.size(); ++I) FRootList->Put(static_cast<int>(I), Scratch[I]);
  FRootList->Unlock();
  for (auto& R : Roots())
    if (R) R->RemoveDependenciesOn(Component);
}

void TComponentDesigner::UpdateRootDependents() {
  for (auto& R : Roots())
    if (R) R->UpdateDependencies();
}

//===----------------------------------------------------------------------===//
// Windows, options and edit commands
//===----------------------------------------------------------------------===//

void TComponentDesigner::HideWindows() {
  for (auto& L : DesignNotificationListeners())
    if (auto W = QueryAs<IDesignWindow>(L)) W->WindowHide();
  for (auto& R : Roots())
    if (R) R->HideForModule();
}

void TComponentDesigner::ShowWindows() {
  for (auto& L : DesignNotificationListeners())
    if (auto W = QueryAs<IDesignWindow>(L)) W->WindowShow();
  for (auto& R : Roots())
    if (R) R->ShowForModule();
}

void TComponentDesigner::SetControlsLocked(bool Value) {
  FControlsLocked = Value;
  for (auto& R : Roots())
    if (R) R->SetControlsLocked(Value);
}

void TComponentDesigner::DesignerOptionsChanged() {
  for (auto& R : Roots())
    if (R) R->UpdateOptions();
}

bool TComponentDesigner::EditAction(TEditAction Action) {
  return FActiveEditHandler ? FActiveEditHandler->EditAction(Action) : false;
}

TEditState TComponentDesigner::GetEditState() { return FActiveEditHandler ? FActiveEditHandler->GetEditState() : TEditState{}; }

void TComponentDesigner::CancelModes() {
  if (FActiveRoot) FActiveRoot->CancelModes();
}

void TComponentDesigner::CopySelectionToStream(TStream* Stream) {
  if (FActiveRoot) FActiveRoot->CopySelectionToStream(Stream);
}

void TComponentDesigner::PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) {
  IPtr<IInternalRoot> Target = FActiveRoot;
  if (Target && Target->IsView())
    if (auto Master = QueryAs<IInternalRoot>(Target->GetMasterView())) Target = Master;
  if (Target) Target->PasteSelectionFromStream(Stream, Parent, Rect);
}

void TComponentDesigner::ModalEditDone(const IPtr<IActivatable>& ReturnWindow) {
  if (ReturnWindow) ReturnWindow->Activated();
}

//===----------------------------------------------------------------------===//
// Classes and custom modules
//===----------------------------------------------------------------------===//

void TComponentDesigner::GetClassUnits(const String& ClassName, const TGetStrProc& Proc) {
  TClass Class = GetClass(ClassName);
  if (!Class || !Class->InheritsFrom(TComponent::StaticClass())) return;
  std::vector<TClass> Chain;
  for (TClass C = Class; C; C = C->Parent) {
    Chain.push_back(C);
    if (C == TComponent::StaticClass()) break;
  }
  for (size_t I = Chain.size(); I-- > 0;) Proc(Chain[I]->UnitName);
}

String TComponentDesigner::FindBaseClass(const String& ClassName) {
  if (ClassName.empty()) return "TForm";
  TCustomModuleReg* Reg = FindCustomModuleReg([&](TCustomModuleReg* R) {
    return SameText(R->FBaseClass->ClassName, ClassName) && SupportsRootClass(R->FBaseClass);
  });
  return Reg ? Reg->FBaseClass->ClassName : "TForm";
}

TClass TComponentDesigner::FindCustomModuleClass(const String& ClassName) {
  if (FEnvironment) FEnvironment->EnsureClassAvailable(ClassName, Self());
  TCustomModuleReg* Reg = FindCustomModuleReg([&](TCustomModuleReg* R) {
    return SameText(R->FBaseClass->ClassName, ClassName) && SupportsRootClass(R->FBaseClass);
  });
  return Reg ? Reg->FCustomModuleClass : nullptr;
}

bool TComponentDesigner::IsRootBaseClass(const String& ClassName) {
  return !ClassName.empty() && FindCustomModuleClass(ClassName) != nullptr;
}

bool TComponentDesigner::IsNestable(const String& ClassName) {
  TClass ModuleClass = FindCustomModuleClass(ClassName);
  if (!ModuleClass) return false;
  IPtr<TBaseCustomModule> Module = NewFromClass<TBaseCustomModule>(ModuleClass, nullptr, nullptr);
  IPtr<ICustomModule> Custom = InterfaceOf<ICustomModule>(Module.Get());
  return Custom && Custom->Nestable();
}

} // namespace formkit
