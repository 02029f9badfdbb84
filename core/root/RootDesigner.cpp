//===- core/root/RootDesigner.cpp - The designer interface of a module ---===//
//
// What `IDesigner` asks of a module beyond selection, creation and names:
// lookups of components and objects, methods of the designed class (kept by the
// host's source), and forwards to the host's environment.
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
// Methods of the designed class: the host's source holds them
//===----------------------------------------------------------------------===//

TMethod TComponentRoot::CreateMethod(const String& Name, const TTypeData* TypeData) {
  return CreateMethod(Name, NewAs<IEventInfo, TEventInfo>(TypeData));
}

TMethod TComponentRoot::CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) {
  if (Name.empty()) return {};
  if (FModule) {
    FModule->CheckWritable();
    FModule->CreateMethod(Name, EventInfo);
  }
  void* Code = FRoot->MethodAddress(Name);
  if (!Code) {
    if (!TRootHooks::CreateSubClassMethod) RaiseServiceNotAvailable("Adding a method to the designed class");
    Code = TRootHooks::CreateSubClassMethod(*this, Name);
  }
  return TMethod{Code, FRoot};
}

String TComponentRoot::GetMethodName(const TMethod& Method) {
  if (!Method.Code || Method.Data != static_cast<void*>(static_cast<TObject*>(FRoot))) return "";
  return FRoot->MethodName(Method.Code);
}

void TComponentRoot::GetMethods(const TTypeData* TypeData, const TGetStrProc& Proc) {
  if (FModule) FModule->GetMethods(NewAs<IEventInfo, TEventInfo>(TypeData), Proc);
}

bool TComponentRoot::MethodExists(const String& Name) { return FModule && FModule->MethodExists(Name, nullptr); }

void TComponentRoot::RenameMethod(const String& CurName, const String& NewName) {
  if (FModule) FModule->RenameMethod(CurName, NewName);
}

void TComponentRoot::ShowMethod(const String& Name) {
  if (FModule) FModule->ShowMethod(Name);
}

void TComponentRoot::ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                               const TTypeData* TypeData) {
  if (FModule) FModule->ChainCall(MethodName, InstanceName, InstanceMethod, NewAs<IEventInfo, TEventInfo>(TypeData));
}

bool TComponentRoot::MethodFromAncestor(const TMethod& Method) {
  if (!FAncestorRoot || !Method.Code) return false;
  TComponent* Ancestor = FAncestorRoot->GetRoot();
  return Ancestor && !Ancestor->MethodName(Method.Code).empty();
}

//===----------------------------------------------------------------------===//
// Components and objects
//===----------------------------------------------------------------------===//

void TComponentRoot::DeleteSelection(bool ADoAll) {
  if (!TRootHooks::DeleteSelection) RaiseServiceNotAvailable("Deleting the selection");
  TRootHooks::DeleteSelection(*this, ADoAll);
}

TComponent* TComponentRoot::GetComponent(const String& Name) {
  if (!FRoot) return nullptr;
  if (SameText(FRoot->Name(), Name)) return FRoot;
  if (TComponent* C = FindNestedComponent(FRoot, Name)) return C;
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  return Env ? Env->FindGlobalComponent(Name) : nullptr;
}

String TComponentRoot::GetComponentName(TComponent* Component) {
  if (!Component) return "";
  if (Component == FRoot || Component->Owner() == FRoot) return Component->Name();
  // A component of another module or of a nested frame: its path from its root.
  String Path = Component->Name();
  for (TComponent* O = Component->Owner(); O && O != FRoot; O = O->Owner()) Path = O->Name() + "." + Path;
  return Path;
}

void TComponentRoot::GetComponentNames(const TTypeData* TypeData, const TGetStrProc& Proc) {
  GetObjectNames(TypeData, Proc);
}

TPersistent* TComponentRoot::GetObject(const String& Name) { return GetComponent(Name); }

String TComponentRoot::GetObjectName(TPersistent* Instance) {
  auto* C = dynamic_cast<TComponent*>(Instance);
  return C ? GetComponentName(C) : (Instance ? Instance->GetNamePath() : "");
}

void TComponentRoot::GetObjectNames(const TTypeData* TypeData, const TGetStrProc& Proc) {
  if (!FRoot) return;
  TClass Wanted = TypeData ? TypeData->ClassRef : nullptr;
  for (int I = 0; I < FRoot->ComponentCount(); ++I) {
    TComponent* C = FRoot->Components(I);
    if (!C->Name().empty() && (!Wanted || C->InheritsFrom(Wanted))) Proc(C->Name());
  }
}

bool TComponentRoot::IsComponentLinkable(TComponent* Component) {
  return Component && (Component == FRoot || RootOf(Component) == FRoot);
}

void TComponentRoot::MakeComponentLinkable(TComponent* Component) {
  if (!Component || !FModule) return;
  TComponent* Target = RootOf(Component);
  if (Target && Target != FRoot) FModule->MakeComponentLinkable(Target->Name());
}

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

void TComponentRoot::Revert(TPersistent*, PPropInfo) {
  // Reverting to the ancestor's value is the update manager's; without one nothing differs.
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

bool TComponentRoot::SpecialPropertyHelp(const String&, String&, String&, int&) { return false; }

void TComponentRoot::ShowHelp() {}

//===----------------------------------------------------------------------===//
// Files, views, streams: joining with their own units
//===----------------------------------------------------------------------===//

void TComponentRoot::Rename(const String& NewFileName) { FFileName = ChangeFileExt(NewFileName, ExtractFileExt(FFileName)); }

void TComponentRoot::Save() {
  if (!TRootHooks::SaveModule) RaiseServiceNotAvailable("Saving a module");
  TRootHooks::SaveModule(*this);
}

void TComponentRoot::GoDormant() { RaiseServiceNotAvailable("Keeping a module dormant"); }

IPtr<IRoot> TComponentRoot::GetView(int Index) { throw EListError(SListIndexError, Index); }

String TComponentRoot::GetViewName(int Index) { throw EListError(SListIndexError, Index); }

int TComponentRoot::AddView(const String&) { RaiseServiceNotAvailable("Adding a view"); }

void TComponentRoot::GetViewPreview(TPersistent*) { RaiseServiceNotAvailable("A view preview"); }

void TComponentRoot::GetViewPreview(const String&, TPersistent*) { RaiseServiceNotAvailable("A view preview"); }

void TComponentRoot::RemoveView(const String&) {}

void TComponentRoot::RemoveView(int Index) { throw EListError(SListIndexError, Index); }

void TComponentRoot::PasteSelectionFromStream(TStream*, TComponent*, const TRect&) {
  RaiseServiceNotAvailable("Pasting components");
}

void TComponentRoot::CopySelectionToStream(TStream*) { RaiseServiceNotAvailable("Copying components"); }

void TComponentRoot::RemoveDependenciesOn(TComponent*) {}

void TComponentRoot::CancelModes() {
  if (FSurfaceDesigner) FSurfaceDesigner->CancelDragging();
}

} // namespace formkit
