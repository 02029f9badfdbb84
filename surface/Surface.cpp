//===- surface/Surface.cpp - The base of a framework's design surface -----===//
#include "surface/Surface.h"

namespace formkit {

FK_IMPLEMENT(TDesignSurface, "Surface") {}

void TDesignSurface::Create(const IPtr<IDesigner>& Designer, TComponent* Root, const IPtr<ISurfaceHost>& Host) {
  FDesigner = Designer;
  FRoot = Root;
  FHost = Host;
}

void TDesignSurface::BeforeDestruction() {
  while (!FContainers.empty()) FContainers.pop_back();
  inherited::BeforeDestruction();
}

bool TDesignSurface::QueryInterface(const TGUID& IID, void** Obj) {
  if (FDesigner && IID != IInterface::IID && detail::ChainHas<IDesigner>(IID)) return FDesigner->QueryInterface(IID, Obj);
  return GetInterface(IID, Obj);
}

void* TDesignSurface::GetInterfaceEntry(const TGUID& IID) {
  if (void* P = detail::FindInterface<TDesignSurface, IComponentDesignSurface, IDesignSurfaceNotify>(this, IID)) return P;
  return inherited::GetInterfaceEntry(IID);
}

void TDesignSurface::RemoveListener(const IPtr<IDesignSurfaceListener>&) { FListener = nullptr; }

void TDesignSurface::Close() { FGrabHandles = nullptr; }

IPtr<IItem> TDesignSurface::CreateItem(const IPtr<IItem>& Parent, const TRect& Rect, bool Scaled) {
  TComponent* Component = FDesigner->CreateCurrentComponentScaled(ExtractComponent(Parent), Rect, Scaled);
  return ItemFromComponent(Component);
}

void TDesignSurface::DeleteSelection() { FHost->DeleteSelection(); }

void TDesignSurface::DestroyItem(const IPtr<IItem>& Item) { Item->Delete(); }

IPtr<IItem> TDesignSurface::GetItems(int Index) { return ItemFromComponent(FHost->GetSelectableComponents(Index)); }

int TDesignSurface::GetItemsCount() { return FHost ? FHost->GetSelectableComponentCount() : 0; }

void TDesignSurface::ValidateModification() { FHost->ValidateModification(); }

void TDesignSurface::Modified() { FHost->Modified(); }

bool TDesignSurface::ItemInSelections(const IPtr<ISelections>& Selections, const IPtr<IItem>& Item) {
  IPtr<IItem> Container = GetContainerItem();
  for (IPtr<IItem> Current = Item; Current && !SameItem(Current, Container); Current = Current->GetParent())
    if (Selections->Selected(Current)) return true;
  return false;
}

void TDesignSurface::SetOptions(const TDesignSurfaceOptions& Options) {
  FGridSize = Options.GridSize;
  FDisplayGrid = Options.DisplayGrid;
  FShowCaptions = Options.ShowComponentCaptions;
  FShowNonVisualComponents = Options.ShowNonVisualComponents;
}

void TDesignSurface::CanInsertComponent(TComponent* Component) { FHost->CanInsertComponent(Component); }

void TDesignSurface::Notification(TPersistent* AnObject, TOperation Operation) {
  if (Operation == opInsert) InstanceInserted(AnObject);
  else InstanceRemoved(AnObject);
}

void TDesignSurface::InstanceInserted(TPersistent* Instance) { FHost->InstanceInserted(Instance); }

void TDesignSurface::InstanceRemoved(TPersistent* Instance) { FHost->InstanceRemoved(Instance); }

String TDesignSurface::UniqueName(const String& BaseName) { return FHost->UniqueName(BaseName); }

void TDesignSurface::SetHost(const IPtr<ISurfaceHost>& Host) {
  if (FHost != Host) FHost = Host;
}

void TDesignSurface::SelectionVerb(TObject*) {}

//===----------------------------------------------------------------------===//
// Menu handlers
//===----------------------------------------------------------------------===//

void TDesignSurface::AlignToGrid(TObject*) { FHost->Command(dmAlignToGrid); }
void TDesignSurface::AppFlipChildrenAll(TObject*) { FHost->Command(dmFlipAllChildren); }
void TDesignSurface::AppFlipChildrenSelected(TObject*) { FHost->Command(dmFlipSelectedChildren); }
void TDesignSurface::AppTextLYT(TObject*) { FHost->Command(dmTextLYT); }
void TDesignSurface::AppViewAsText(TObject*) { FHost->Command(dmViewAsText); }
void TDesignSurface::RevertComponent(TObject*) { FHost->Command(dmRevert); }
void TDesignSurface::AppShowNonVisualComponents(TObject*) { FHost->Command(dmShowNonVisualComponents); }
void TDesignSurface::AppAlignDialog(TObject*) { FHost->Dialog(ddAlign); }
void TDesignSurface::AppSizeDialog(TObject*) { FHost->Dialog(ddSize); }
void TDesignSurface::AppScaleDialog(TObject*) { FHost->Dialog(ddScale); }
void TDesignSurface::AppTabOrderDialog(TObject*) { FHost->Dialog(ddTabOrder); }
void TDesignSurface::AppCreationOrderDialog(TObject*) { FHost->Dialog(ddCreationOrder); }
void TDesignSurface::AppSaveTemplateDialog(TObject*) { FHost->Dialog(ddSaveTemplate); }

} // namespace formkit
