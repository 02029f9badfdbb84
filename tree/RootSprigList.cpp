//===- tree/RootSprigList.cpp - A root sprig for each open designer ------===//
//
// The list of root sprigs by root component, and the design notification
// listener that keeps it, and the trees in it, in step with the designers.
//
//===----------------------------------------------------------------------===//
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

namespace formkit {

FK_IMPLEMENT(TRootSprigList, "TreeIntf") {}

namespace {

/// Forwards each design notification to the one root sprig list.
class TDesignNotificationHandler : public TInterfacedObject, public IDesignNotification {
  FK_CLASS(TDesignNotificationHandler, TInterfacedObject)
  FK_INTERFACES(IDesignNotification)
  TDesignNotificationHandler() = default;

  void ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) override {
    RootSprigList()->ItemDeleted(ADesigner, AItem);
  }
  void ItemInserted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) override {
    RootSprigList()->ItemInserted(ADesigner, AItem);
  }
  void ItemsModified(const IPtr<IDesigner>& ADesigner) override { RootSprigList()->ItemsModified(ADesigner); }
  /// The host view's bridge follows the selection, not the tree.
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}
  void DesignerOpened(const IPtr<IDesigner>& ADesigner, bool AResurrecting) override {
    RootSprigList()->DesignerOpened(ADesigner, AResurrecting);
  }
  void DesignerClosed(const IPtr<IDesigner>& ADesigner, bool AGoingDormant) override {
    RootSprigList()->DesignerClosed(ADesigner, AGoingDormant);
  }
};

FK_IMPLEMENT(TDesignNotificationHandler, "TreeIntf") {}

TObjectGuard<TRootSprigList> GRootSprigList;
IPtr<IDesignNotification> GDesignNotification;

} // namespace

TRootSprigList* RootSprigList() {
  if (!GRootSprigList) GRootSprigList.Reset(new TRootSprigList());
  return GRootSprigList.Get();
}

void InitDesignNotification() {
  if (GDesignNotification) return;
  GDesignNotification = InterfaceOf<IDesignNotification>(New<TDesignNotificationHandler>().Get());
  RegisterDesignNotification(GDesignNotification);
}

void DoneDesignNotification() {
  if (!GDesignNotification) return;
  UnregisterDesignNotification(GDesignNotification);
  GDesignNotification = nullptr;
}

namespace detail {
/// Frees the list with the trees still in it; the tree's stop step calls it.
void FreeRootSprigList() noexcept { GRootSprigList.Reset(); }
} // namespace detail

//===----------------------------------------------------------------------===//
// TRootSprigList
//===----------------------------------------------------------------------===//

void TRootSprigList::DesignerOpened(const IPtr<IDesigner>& ADesigner, bool) {
  if (!ADesigner) return;
  TComponent* Root = ADesigner->GetRoot();
  if (!Root || FList.contains(Root)) return;
  TRootSprigClass SprigClass = FindBestRootSprigClass(Root->ClassType());
  if (!SprigClass) return;
  TObjectGuard<TSprig> Sprig = NewSprig(SprigClass, Root);
  static_cast<TRootSprig*>(Sprig.Get())->SetDesigner(ADesigner);
  FList.emplace(Root, static_cast<TRootSprig*>(Sprig.Get()));
  (void)Sprig.Release();
}

void TRootSprigList::DesignerClosed(const IPtr<IDesigner>& ADesigner, bool) {
  TRootSprig* Sprig = nullptr;
  if (!FindRoot(ADesigner, Sprig)) return;
  FList.erase(ADesigner->GetRoot());
  TObjectGuard<TRootSprig> Owned(Sprig);
  Sprig->SetDesigner(nullptr);
  Sprig->SetSprigDesigner(nullptr);
}

bool TRootSprigList::FindRoot(const IPtr<IDesigner>& ADesigner, TRootSprig*& ARootSprig) {
  ARootSprig = nullptr;
  if (!ADesigner) return false;
  auto It = FList.find(ADesigner->GetRoot());
  if (It == FList.end()) return false;
  ARootSprig = It->second;
  return true;
}

void TRootSprigList::StructureChanged(TRootSprig* ARoot, const IPtr<IDesigner>& ADesigner) {
  if (ARoot->StructureContext() && ARoot->UpdateLocks() == 0 && OnStructureChanged)
    OnStructureChanged(ARoot, ADesigner);
}

void TRootSprigList::ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) {
  TRootSprig* Sprig = nullptr;
  if (!FindRoot(ADesigner, Sprig)) return;
  Sprig->ItemDeleted(AItem);
  StructureChanged(Sprig, ADesigner);
}

void TRootSprigList::ItemInserted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) {
  TRootSprig* Sprig = nullptr;
  if (!FindRoot(ADesigner, Sprig)) return;
  Sprig->ItemInserted(AItem);
  StructureChanged(Sprig, ADesigner);
}

void TRootSprigList::ItemsModified(const IPtr<IDesigner>& ADesigner) {
  TRootSprig* Sprig = nullptr;
  if (!FindRoot(ADesigner, Sprig)) return;
  Sprig->ItemsModified(true);
  StructureChanged(Sprig, ADesigner);
}

void TRootSprigList::BeforeDestruction() {
  while (!FList.empty()) {
    TObjectGuard<TRootSprig> Owned(FList.begin()->second);
    FList.erase(FList.begin());
    Owned->SetDesigner(nullptr);
    Owned->SetSprigDesigner(nullptr);
  }
  inherited::BeforeDestruction();
}

} // namespace formkit
