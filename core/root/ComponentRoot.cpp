//===- core/root/ComponentRoot.cpp - Lifecycle and state of a module -----===//
#include "core/root/ComponentRoot.h"

#include "core/CustomModules.h"
#include "core/Designers.h"
#include "core/DesignNotifications.h"
#include "core/root/RootFormEditor.h"
#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

namespace formkit {


FK_IMPLEMENT(TClassPaletteItem, "ComponentDesigner") {}
FK_IMPLEMENT(TComponentRoot, "ComponentDesigner") {}

//===----------------------------------------------------------------------===//
// Hooks of later parts
//===----------------------------------------------------------------------===//

std::function<void(TComponentRoot&, const String&, TComponent*)> TRootHooks::InheritFrom;
std::function<IPtr<IUpdateManager>(TComponentRoot&, TComponent*, TComponent*, const IPtr<IUpdateManager>&)>
    TRootHooks::CreateUpdateManager;
std::function<void(const IPtr<IUpdateManager>&)> TRootHooks::UpdateManagerModified;
std::function<void(const IPtr<IUpdateManager>&, TPersistent*)> TRootHooks::UpdateManagerRemoved;
std::function<bool(const IPtr<IUpdateManager>&, const String&)> TRootHooks::UpdateManagerNameExists;
std::function<IPtr<IComponentEditor>(TComponent*, const IPtr<IDesigner>&)> TRootHooks::GetComponentEditor;
std::function<TComponent*(const IPtr<IUpdateManager>&)> TRootHooks::UpdateManagerComponent;
std::function<void(const IPtr<IUpdateManager>&, const String&, const String&)> TRootHooks::UpdateManagerRenameDescendents;
std::function<bool(const IPtr<IUpdateManager>&, TPersistent*, PPropInfo)> TRootHooks::UpdateManagerCanRevert;
std::function<void(const IPtr<IUpdateManager>&, TPersistent*, PPropInfo)> TRootHooks::UpdateManagerRevert;
std::function<void(TComponent*, const String&, const String&, TClass)> TRootHooks::CreateSubClass;
std::function<void(TComponent*, const String&, const String&)> TRootHooks::RenameSubClass;
std::function<void*(TComponent*, const String&)> TRootHooks::CreateSubClassMethod;
std::function<void(TComponent*, void*, const String&)> TRootHooks::RenameSubClassMethod;
std::function<void(TComponent*, void*)> TRootHooks::DestroySubClassMethod;
std::function<void(TComponentRoot&, TComponent*, const String&, const String&)> TRootHooks::NotifyFormEditorRenamed;
std::function<bool(TClass)> TRootHooks::IsProxyClass;
std::function<void(TComponent*, TClass)> TRootHooks::ChangeToProxyClass;
std::function<void(TComponentRoot&, TComponent*)> TRootHooks::ValidateInheritence;
std::function<void(TComponentRoot&, TComponent*, const TGetStrProc&)> TRootHooks::SelectionEditorUnits;
std::function<void(const IPtr<IUpdateManager>&)> TRootHooks::UpdateManagerUpdate;
std::function<void(const IPtr<IUpdateManager>&, TComponent*, const IPtr<IUpdateManager>&)>
    TRootHooks::UpdateManagerJoinAncestor;
std::function<void(const String&)> TRootHooks::SendDesignerCommand;

void RaiseServiceNotAvailable(const char* Service) { throw EComponentDesignerException(sServiceNotAvailable, Service); }

std::function<int(const IPtr<IItem>&)> GetPPIForKilnDesignerForIItemFunc;

int PPIForItem(const IPtr<IItem>& Item) {
  return GetPPIForKilnDesignerForIItemFunc ? GetPPIForKilnDesignerForIItemFunc(Item) : 96;
}

//===----------------------------------------------------------------------===//
// Construction
//===----------------------------------------------------------------------===//

void TComponentRoot::Create(const TCreateArgs& Args) {
  FViewName = Args.ViewName;
  FViewModule = QueryAs<IDesignerViewModule>(Args.Module);
  FDesigner = QueryAs<IInternalComponentDesigner>(Args.Designer);
  if (!FDesigner) throw EComponentDesignerException("A module on design needs the designer of its framework");
  if (auto All = Designers()) All->ActivateDesigner(Args.Designer);
  FModule = Args.Module;
  FDesigner->RootListAdd(AsRoot());
  bool Initializing = false;
  try {
    FFileSystem = Args.FileSystem;
    FFileName = Args.FileName;
    FSelections = New<TSelections>(NewAs<ISelections, TSimpleSelections>());
    FSelections->FOnChanged = [this] { SelectionsChanged(); };
    FUpdateManagers = NewAs<IInterfaceList, TInterfaceList>();
    FCreateFrameManagers = true;
    if (!Args.Existing && !Args.Stream) {
      CreateNewModule(Args);
      FDiskAge = GetEnvironment() ? GetEnvironment()->GetTimestamp() : -1;
    } else {
      ReadExistingModule(Args);
    }
    Initializing = true;
    LoadDependentModules(FRoot);
    // A module that differs from its stream after an error passed over keeps its new stamp.
    InternalInitializeDesigner(false);
    UpdateOptions();
    // Reading and the surface can add references.
    LoadDependentModules(FRoot);
  } catch (...) {
    if (Initializing) {
      FAllowNoSelection = true;
      InternalDeinitializeDesigner(false);
    } else if (FRoot) {
      TComponent* Half = FRoot;
      FRoot = nullptr;
      TearDownRoot();
      DestroyRootInstance(Half);
    }
    FDesigner->RootListRemove(AsRoot());
    FCustomModule = nullptr;
    throw;
  }
}

void TComponentRoot::CreateNewModule(const TCreateArgs& Args) {
  String ClassName = Args.FormName.empty() ? String() : "T" + Args.FormName;
  String AncestorName = Args.AncestorName.empty() ? String() : "T" + Args.AncestorName;
  CreateRootAs(ClassName, AncestorName, Args.AncestorRoot);
  if (FAncestorRoot) {
    if (auto Listener = InterfaceOf<IDesignNotification>(FRoot)) Listener->ItemsModified(AsDesigner());
  } else {
    InitNewRoot(FRoot, Args.FormName);
  }
  NewRootCreated(FRoot, Args.FormName);
}

TComponent* TComponentRoot::CreateRootAs(const String& ClassName, const String& AncestorClassName,
                                         const IPtr<IRoot>& AncestorRoot) {
  SetCreateInfo(AncestorClassName, AncestorRoot);
  CreateRootInstance(ClassName);
  String Name = (AncestorRoot && FViewName.empty() && AncestorRoot->GetRoot())
                    ? AncestorRoot->GetRoot()->ClassName().substr(1)
                    : (ClassName.empty() ? String() : ClassName.substr(1));
  FRoot->ChangeName(Name.substr(0, 255));
  return FRoot;
}

void TComponentRoot::SetCreateInfo(const String& AncestorClassName, const IPtr<IRoot>& AncestorRoot) {
  if (IPtr<IOTAModuleNotifier> Notifier = std::exchange(FAncestorRootNotifier, nullptr)) Notifier->Destroyed();
  IPtr<IRoot> Ancestor = AncestorRoot;
  if (!Ancestor && !FDesigner->IsRootBaseClass(AncestorClassName) && !AncestorClassName.empty()) {
    Ancestor = FDesigner->OpenRootClass(AncestorClassName);
    if (!Ancestor) throw EClassNotFound(Format("Ancestor for '%s' not found", AncestorClassName));
  }
  FAncestorRoot = QueryAs<IInternalRoot>(Ancestor);
  if (FAncestorRoot) {
    FRootBaseClass = FAncestorRoot->GetRootBaseClass()->ClassName;
    FCustomModuleClass = FAncestorRoot->GetCustomModuleClass();
    FAncestorRootNotifier = NewAs<IOTAModuleNotifier, TAncestorNotifier>(this);
  } else {
    FRootBaseClass = FDesigner->FindBaseClass(AncestorClassName);
    FCustomModuleClass = FDesigner->FindCustomModuleClass(AncestorClassName);
  }
}

TComponent* TComponentRoot::CreateRootInstance(const String& ClassName) {
  FReadError = false;
  auto* Instance = static_cast<TComponent*>(GetRootClass()->NewInstance());
  FRoot = Instance;
  try {
    InitRootInstance(Instance);
    Instance->SetDesigning(true, true);
    Instance->SetDesignInstance(true);
  } catch (...) {
    FRoot = nullptr;
    Instance->Destroy(); // no constructor ran: nothing else to undo
    throw;
  }
  try {
    RunConstructor(Instance, nullptr);
  } catch (...) {
    FRoot = nullptr; // the failed constructor destroyed the instance
    throw;
  }
  if (FCustomModuleClass) {
    IPtr<TBaseCustomModule> Module = NewFromClass<TBaseCustomModule>(FCustomModuleClass, FRoot, AsDesigner());
    FCustomModule = InterfaceOf<ICustomModule>(Module.Get());
  }
  RootInstanceReady();
  if (FAncestorRoot) {
    if (!TRootHooks::InheritFrom) RaiseServiceNotAvailable("Inheriting from a module");
    FCreateFrameManagers = false;
    try {
      TRootHooks::InheritFrom(*this, ClassName, FAncestorRoot->GetRoot());
    } catch (...) {
      FCreateFrameManagers = true;
      throw;
    }
    FRoot->SetAncestor(true);
    FCreateFrameManagers = true;
  } else if (TRootHooks::CreateSubClass) {
    // The module's own class, on the framework's: where its handlers get their codes.
    TRootHooks::CreateSubClass(FRoot, ClassName, FModule ? FModule->GetUnitName() : String(), GetRootClass());
  }
  return FRoot;
}

TClass TComponentRoot::GetRootClass() {
  if (FRootClass) return FRootClass;
  TCustomModuleReg* Reg = FindCustomModuleReg([&](TCustomModuleReg* R) {
    return SameText(R->FBaseClass->ClassName, FRootBaseClass) && FDesigner->SupportsRootClass(R->FBaseClass);
  });
  if (!Reg) throw EComponentDesignerException(sRootClassNotFound, FRootBaseClass);
  FRootClass = Reg->FBaseClass;
  return FRootClass;
}

String TComponentRoot::GetDesignClassName() {
  Resurrect(); // the class data must be live
  if (AnsiStartsText("TFORM", FRootBaseClass)) {
    TCustomModuleReg* Reg = FindCustomModuleReg([&](TCustomModuleReg* R) {
      return SameText(R->FBaseClass->ClassName, FRootBaseClass) && FDesigner->SupportsRootClass(R->FBaseClass);
    });
    if (Reg) return "";
  }
  return FRootBaseClass;
}

String TComponentRoot::GetAncestorName() {
  TClass C = GetRootClass();
  return C->Parent ? C->Parent->ClassName : "";
}

String TComponentRoot::GetRootClassName() {
  // The designed class once there is a root ("TForm1"), so that the root's handlers are
  // named after it; the framework's class before.
  return FRoot ? FRoot->ClassName() : GetRootClass()->ClassName;
}

String TComponentRoot::GetRootName() { return FRoot ? FRoot->Name() : FRootName; }

void TComponentRoot::SetRootName(const String& Name) {
  FRoot->SetName(Name);
  Modified();
}

IPtr<IDesignEnvironment> TComponentRoot::GetEnvironment() { return FDesigner ? FDesigner->GetEnvironment() : nullptr; }

//===----------------------------------------------------------------------===//
// Opening and closing the designer
//===----------------------------------------------------------------------===//

void TComponentRoot::InternalInitializeDesigner(bool Resurrecting) {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  FModifyTime = (FReadError && Env) ? Env->GetTimestamp() : FDiskAge;
  if (TRootHooks::CreateUpdateManager)
    FRootUpdateManager = TRootHooks::CreateUpdateManager(
        *this, FRoot, FAncestorRoot ? FAncestorRoot->GetRoot() : nullptr,
        FAncestorRoot ? FAncestorRoot->GetUpdateManager() : nullptr);
  if (TRootHooks::GetComponentEditor) FRootEditor = TRootHooks::GetComponentEditor(FRoot, AsDesigner());
  InitializeSurface();
  if (FSurface) FSurface->SetInitializing(true);
  try {
    DesignNotificationDesignerOpened(AsDesigner(), Resurrecting);
  } catch (...) {
    if (FSurface) FSurface->SetInitializing(false);
    throw;
  }
  if (FSurface) FSurface->SetInitializing(false);
}

void TComponentRoot::InternalDeinitializeDesigner(bool GoingDormant) {
  IPtr<ISelections> Items = SelectionItems();
  if (Items) {
    Items->BeginSelections();
    Items->Clear();
  }
  DesignNotificationDesignerClosed(AsDesigner(), GoingDormant);
  if (FRoot) FRootName = FRoot->Name();
  if (FSurface) {
    FSurface->Close();
    FSurface = nullptr;
  }
  if (FSurfaceDesigner) {
    FSurfaceDesigner->Close();
    FSurfaceDesigner = nullptr;
  }
  TearDownRoot();
  FreeUndoStream();
  ClearDependencies();
  ClearDependents();
  FRootEditor = nullptr;
  FRootUpdateManager = nullptr;
  if (FUpdateManagers) FUpdateManagers->Clear();
  FreeRootStream();
  if (TComponent* Root = FRoot) {
    FRoot = nullptr;
    DestroyRootInstance(Root);
  }
  FCustomModule = nullptr;
  FMarkedItems = nullptr;
  FRootClass = nullptr;
  if (Items) Items->EndSelections();
}

void TComponentRoot::FreeRootStream() noexcept { FreeAndNil(FRootStream); }

void TComponentRoot::BeforeDestruction() {
  if (TOTAFormEditor* Editor = std::exchange(FOTAFormEditor, nullptr)) {
    Editor->NotifyDestruct();
    FOTAFormEditorRef = nullptr;
  }
  FSelections = nullptr;
  FreeRootStream();
  FreeUndoStream();
  FreeAndNil(FDormantStream);
  ClearDependencies();
  ClearDependents();
  if (IPtr<IOTAModuleNotifier> Notifier = std::exchange(FAncestorRootNotifier, nullptr)) Notifier->Destroyed();
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// Options and changes
//===----------------------------------------------------------------------===//

void TComponentRoot::UpdateOptions() {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  if (!Env) return;
  TDesignerOptions Options;
  Env->GetDesignerOptions(Options);
  if (FSurfaceDesigner) {
    int PPI = PPIForItem(FindCurrentParentItem());
    TPoint Grid{Options.GridSizeX, Options.GridSizeY};
    if (Options.ScaleGridSize) Grid = {MulDiv(Grid.X, PPI, 96), MulDiv(Grid.Y, PPI, 96)};
    FSurfaceDesigner->SetGridSize(Grid);
    FSurfaceDesigner->SetGridAligned(Options.SnapToGrid);
    FSurfaceDesigner->SetGuidelines(Options.UseDesignerGuidelines);
  }
  if (FSurface) {
    TDesignSurfaceOptions SurfaceOptions;
    SurfaceOptions.DisplayGrid = Options.DisplayGrid;
    SurfaceOptions.ScaleGridSize = Options.ScaleGridSize;
    SurfaceOptions.GridSize = {Options.GridSizeX, Options.GridSizeY};
    SurfaceOptions.ShowComponentCaptions = Options.ShowComponentCaptions;
    SurfaceOptions.ShowDesignerHints = Options.ShowDesignerHints;
    SurfaceOptions.ShowNonVisualComponents = Options.ShowNonVisualComponents;
    SurfaceOptions.ShowExtendedControlHints = Options.ShowExtendedControlHints;
    FSurface->SetOptions(SurfaceOptions);
  }
}

void TComponentRoot::Modified() {
  FGeneratePreview = true;
  if (FOTAFormEditor) FOTAFormEditor->FormModified();
  if (FModule) {
    FModule->Modified();
    FModule->Notify(ncFormModified);
  }
  FDesigner->RootModified(AsRoot());
  if (FSurface) FSurface->BeforeRootModified();
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) FModifyTime = Env->GetTimestamp();
  FreeRootStream();
  ClearDependencies();
  if (!FRevertingComponent) ModifiedUpdateNotification();
  GlobalFixupReferences();
  if (FSurface) FSurface->UpdateSurface();
  if (FAncestorRoot && FAncestorRoot->GetModule() == FModule) FAncestorRoot->ModifiedUpdateNotification();
}

void TComponentRoot::ModifiedUpdateNotification() {
  if (!TRootHooks::UpdateManagerModified) return;
  if (FRootUpdateManager) TRootHooks::UpdateManagerModified(FRootUpdateManager);
  for (int I = 0; FUpdateManagers && I < FUpdateManagers->GetCount(); ++I)
    TRootHooks::UpdateManagerModified(QueryAs<IUpdateManager>(FUpdateManagers->Get(I)));
}

namespace {
/// The object behind a manager: two references to one manager may differ.
const void* ManagerIdentity(const IPtr<IUpdateManager>& Manager) {
  if (auto Impl = QueryAs<IImplementation>(Manager)) return Impl->GetInstance();
  return QueryAs<IInterface>(Manager).Get();
}
} // namespace

void TComponentRoot::Updating(const IPtr<IUpdateManager>&) { FIgnoreRename = true; }

void TComponentRoot::Updated(const IPtr<IUpdateManager>& Manager) {
  FIgnoreRename = false;
  if (FSurface) {
    FSurface->RefreshItems();
    FSurface->UpdateSurface();
  }
  if (FRootUpdateManager && TRootHooks::UpdateManagerModified &&
      ManagerIdentity(FRootUpdateManager) != ManagerIdentity(Manager))
    TRootHooks::UpdateManagerModified(FRootUpdateManager);
  DesignNotificationDescendantUpdated(AsDesigner());
}

//===----------------------------------------------------------------------===//
// Windows
//===----------------------------------------------------------------------===//

void TComponentRoot::Close() {
  FClosing = true;
  auto Closed = Finally([this]() noexcept { FClosing = false; });
  CloseViews();
  FDesigner->RootListRemove(AsRoot());
  InternalDeinitializeDesigner(false);
  FAllowNoSelection = true;
  ClearSelection();
  if (FUpdateManagers) FUpdateManagers->Clear();
  if (IsView()) FAncestorRoot = nullptr;
}

void TComponentRoot::SetActive(bool Value) {
  if (FSurface)
    if (IPtr<IGrabHandles> Handles = FSurface->GetGrabHandles())
      Handles->SetHandlesActive(Value && !(FSurfaceDesigner && FSurfaceDesigner->GetLocked()));
  SetActiveView(AsRoot());
}

void TComponentRoot::SetControlsLocked(bool Value) {
  if (!FSurfaceDesigner) return;
  if (Value) FSurfaceDesigner->Lock();
  else FSurfaceDesigner->Unlock();
}

bool TComponentRoot::CanModify() { return !(FModule && FModule->GetReadOnly()); }

bool TComponentRoot::IsSourceReadOnly() { return FModule && FModule->GetReadOnly(); }

void TComponentRoot::ValidateModification() {
  if (IsSourceReadOnly()) throw EComponentDesignerException(sReadOnlySource);
  if (FModule) FModule->CheckWritable();
}

void TComponentRoot::Edit(TComponent* Component) {
  IPtr<IComponentEditor> Editor;
  if (Component == FRoot) {
    Editor = FRootEditor;
  } else if (IPtr<IItem> Item = FindSelection(Component)) {
    if (auto Internal = QueryAs<IInternalItem>(Item)) Editor = Internal->GetEditor();
  }
  if (Editor) Editor->Edit();
}

} // namespace formkit
