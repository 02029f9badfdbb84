//===- core/root/RootDesigner.cpp - The designer interface of a module ---===//
//
// What `IDesigner` asks of a module beyond selection, creation, names and
// methods: deletion, links to the project, and forwards to the host's
// environment.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "core/Designers.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// Activation
//===----------------------------------------------------------------------===//

void TComponentRoot::Activate() {
  Show();
  FDesigner->RootActivated(AsRoot());
}

//===----------------------------------------------------------------------===//
// Components and the project
//===----------------------------------------------------------------------===//

bool TComponentRoot::IsComponentHidden(TComponent* Component) {
  return Component && Component->ComponentStyle().Contains(csTransient);
}

void TComponentRoot::GetProjectModules(const TGetModuleProc& Proc) {
  if (FModule) FModule->GetProjectModules(Proc);
}

IPtr<IDesigner> TComponentRoot::GetAncestorDesigner() { return QueryAs<IDesigner>(FAncestorRoot); }

TComponent* TComponentRoot::FindRootAncestor(const String& Name) {
  IPtr<IRoot> Root = FDesigner->OpenRootClass(Name);
  return Root ? Root->GetRoot() : nullptr;
}

void TComponentRoot::ModuleFileNames(String& ImplFileName, String& IntfFileName, String& FormFileName) {
  ImplFileName.clear();
  IntfFileName.clear();
  FormFileName = FFileName;
  if (auto Module = QueryAs<IOTAModule>(FModule)) {
    int Count = Module->GetModuleFileCount();
    if (Count > 0) ImplFileName = Module->GetModuleFileName(0);
    if (Count > 2) IntfFileName = Module->GetModuleFileName(1);
    if (Count > 1) FormFileName = Module->GetModuleFileName(Count - 1);
  }
}

//===----------------------------------------------------------------------===//
// Forwards to the host
//===----------------------------------------------------------------------===//

IPtr<IOTABasePaletteItem> TComponentRoot::GetPaletteItem(TClass ComponentClass) {
  IPtr<IOTABasePaletteItem> Item;
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->GetPaletteItem(ComponentClass, Item);
  return Item;
}

String TComponentRoot::GetPathAndBaseExeName() {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->GetPathAndBaseExeName() : "";
}

String TComponentRoot::GetPrivateDirectory() {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->GetPrivateDirectory() : "";
}

String TComponentRoot::GetBaseRegKey() {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->GetBaseRegKey() : "";
}

String TComponentRoot::GetAppDataDirectory(bool Local) {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->GetAppDataDirectory(Local) : "";
}

IPtr<IInterface> TComponentRoot::GetIDEOptions() {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->GetIDEOptions() : nullptr;
}

void TComponentRoot::ModalEdit(char EditKey, const IPtr<IActivatable>& ReturnWindow) {
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->ModalEdit(EditKey, ReturnWindow);
}

TShiftState TComponentRoot::GetShiftState() {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->GetShiftState() : TShiftState{};
}

void TComponentRoot::SelectItemName(const String& PropertyName) {
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->SelectItemName(PropertyName);
}

String TComponentRoot::GetDesignerExtension() {
  auto Designer = QueryAs<IComponentDesigner>(FDesigner);
  return Designer ? Designer->GetDesignerExtension() : "";
}

TRect TComponentRoot::GetScrollRanges(const TPoint& ScrollPosition) {
  TRect Range{ScrollPosition.X, ScrollPosition.Y, ScrollPosition.X, ScrollPosition.Y};
  if (!FSurface) return Range;
  for (int I = 0, N = FSurface->GetItemsCount(); I < N; ++I)
    if (IPtr<IItem> Item = FSurface->GetItems(I)) Range = UnionRect(Range, Item->GetBoundsRect());
  return Range;
}

IPtr<IPopupMenu> TComponentRoot::BuildLocalMenu(TLocalMenuTypes Filter) {
  IPtr<IDesignLocalMenu> Host = QueryAs<IDesignLocalMenu>(GetEnvironment());
  return Host ? Host->BuildLocalMenu(Filter) : nullptr;
}

bool TComponentRoot::SpecialPropertyHelp(const String&, String&, String&, int&) { return false; }

void TComponentRoot::ShowHelp() {}

void TComponentRoot::CancelModes() {
  if (FSurfaceDesigner) FSurfaceDesigner->CancelDragging();
}

} // namespace formkit
