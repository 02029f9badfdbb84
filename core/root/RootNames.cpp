//===- core/root/RootNames.cpp - Names of a module's components ----------===//
//
// Names are made free across the module's family, checked before the component
// framework stores them, and carried to the host's source, the descendants and
// the listeners. Names are looked up, and offered as link targets, across the
// open modules: "Frame1.Button1" is a component of a nested frame, "Form2" the
// root of another module, "Form2.Button1" one of its components.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "core/Designers.h"
#include "core/Events.h"

namespace formkit {

namespace {
/// Separates a module's name from a component's in a qualified name.
constexpr char DotSep = '.';
} // namespace

//===----------------------------------------------------------------------===//
// Making and checking names
//===----------------------------------------------------------------------===//

String TComponentRoot::UniqueName(const String& BaseName) {
  // TButton gives the stem Button; a lone T stays, and only the first letter counts.
  String Stem = (BaseName.size() >= 2 && BaseName[0] == 'T') ? BaseName.substr(1, 255) : BaseName;
  bool ThroughFamily = FRootUpdateManager && TRootHooks::UpdateManagerComponent &&
                       TRootHooks::UpdateManagerNameExists && TRootHooks::UpdateManagerComponent(FRootUpdateManager);
  for (int I = 1;; ++I) {
    String Candidate = Stem + std::to_string(I);
    bool Taken = ThroughFamily ? TRootHooks::UpdateManagerNameExists(FRootUpdateManager, Candidate)
                               : (FRoot && FRoot->FindComponent(Candidate));
    if (!Taken) return Candidate;
  }
}

bool TComponentRoot::IsModifiableFrame(TComponent* Component) const {
  for (TComponent* F : FModifiableFrames)
    if (F == Component) return true;
  return false;
}

IPtr<ICompInfo> TComponentRoot::NewCompInfo(TPersistent* Instance) {
  return NewAs<ICompInfo, TCompInfo>(IPtr<IInternalRoot>(static_cast<IInternalRoot*>(this)), Instance);
}

void TComponentRoot::ValidateRename(TComponent* Component, const String& CurName, const String& NewName) {
  if (Component && Component != FRoot && Component->Owner() && Component->Owner() != FRoot) {
    // A component of a nested frame: only what the frame's module introduced is guarded.
    TComponentState State = Component->ComponentState();
    if (State.Contains(csAncestor) && !State.Contains(csDestroying) && !CurName.empty() && !FIgnoreRename &&
        !FRevertingComponent && IsModifiableFrame(Component->Owner()))
      throw EComponentDesignerException(sRenamingAncestor, CurName);
    return;
  }
  if (Component && Component == FRoot && FRoot->Owner() && FRoot->ComponentState().Contains(csLoading)) return;

  if (Component && Component != FRoot) ValidateComponentRename(Component, CurName, NewName);
  else ValidateRootRename(CurName, NewName);

  if (FRoot && !FRoot->ComponentState().Contains(csLoading) && !NewName.empty() &&
      (Component == FRoot || (Component && Component->Owner()))) {
    FDesigner->UpdateRootDependents();
    // Their stored streams may refer to the old name.
    for (TComponentRoot* Dependent : FDependents) Dependent->FreeRootStream();
  }
  if (EvComponentRenamedEvent) EvComponentRenamedEvent->Send(this, CurName, NewName);
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->ComponentRenamed(CurName, NewName);
}

void TComponentRoot::ValidateComponentRename(TComponent* Component, const String& CurName, const String& NewName) {
  bool FromAncestor = Component->ComponentState().Contains(csAncestor);
  if (FRootUpdateManager && CompareText(CurName, NewName) != 0 && TRootHooks::UpdateManagerNameExists &&
      TRootHooks::UpdateManagerNameExists(FRootUpdateManager, NewName))
    throw EComponentDesignerException(sComponentAlreadyExists, NewName);
  if (FromAncestor && !CurName.empty() && !FIgnoreRename && !FRevertingComponent)
    throw EComponentDesignerException(sRenamingAncestor, CurName);
  // The name is reserved: it stands for the owner in references.
  if (CompareText(NewName, "OWNER") == 0) throw EComponentDesignerException(sComponentAlreadyExists, NewName);
  if (!FromAncestor && (NewName.empty() || (!FIgnoreRename && Component->Owner() == FRoot)) && FModule)
    FModule->RenameComponent(NewCompInfo(Component), CurName, NewName);
  if (FRootUpdateManager && TRootHooks::UpdateManagerRenameDescendents)
    TRootHooks::UpdateManagerRenameDescendents(FRootUpdateManager, CurName, NewName);
  if (TRootHooks::NotifyFormEditorRenamed) TRootHooks::NotifyFormEditorRenamed(*this, Component, CurName, NewName);
}

void TComponentRoot::ValidateRootRename(const String& CurName, const String& NewName) {
  if (NewName.empty()) throw EComponentDesignerException(sRootMustHaveName);
  String ClassName = "T" + NewName;
  if (FRoot)
    for (TClass C = FRoot->ClassType()->Parent; C; C = C->Parent)
      if (CompareText(C->ClassName, ClassName) == 0) throw EComponentDesignerException(sAncestorClassName, ClassName);
  if (!GetMasterView() && FModule && FRoot) FModule->ValidateComponentName(NewCompInfo(FRoot), NewName);
  if (FRoot && TRootHooks::RenameSubClass) TRootHooks::RenameSubClass(FRoot, ClassName, "");
  for (int I = 0, N = GetViewCount(); I < N; ++I)
    if (IPtr<IRoot> View = GetView(I); View && View->GetRoot()) View->GetRoot()->SetName(NewName + "_" + GetViewName(I));
  if (FRoot && TRootHooks::NotifyFormEditorRenamed) TRootHooks::NotifyFormEditorRenamed(*this, FRoot, CurName, NewName);
}

bool TComponentRoot::RenameComponent(const String& CurName, const String& NewName) {
  TComponent* C = FRoot ? FRoot->FindComponent(CurName) : nullptr;
  if (!C) return false;
  C->SetName(NewName);
  return true;
}

void TComponentRoot::Rename(const String& NewFileName) {
  String Ext = ExtractFileExt(FFileName);
  FFileName = ChangeFileExt(NewFileName, Ext);
  // The class keeps its name and moves to the module's unit.
  if (FRoot && TRootHooks::RenameSubClass)
    TRootHooks::RenameSubClass(FRoot, FRoot->ClassName(), FModule ? FModule->GetUnitName() : String());
  for (int I = 0, N = GetViewCount(); I < N; ++I) {
    auto View = QueryAs<IInternalRoot>(GetView(I));
    if (auto* ViewRoot = View ? dynamic_cast<TComponentRoot*>(View->Implementor()) : nullptr)
      ViewRoot->FFileName = ChangeFileExt(FFileName, Format(".%s%s", GetViewName(I), Ext));
  }
}

//===----------------------------------------------------------------------===//
// Looking names up across modules
//===----------------------------------------------------------------------===//

TComponent* TComponentRoot::FindRootComponent(const String& Name) {
  IPtr<IRoot> Root = FDesigner->FindRoot(Name);
  return Root ? Root->GetRoot() : nullptr;
}

TComponent* TComponentRoot::GetComponent(const String& Name) {
  if (!FRoot) return nullptr;
  if (TComponent* C = FindNestedComponent(FRoot, Name)) return C;
  std::size_t Dot = Name.find(DotSep);
  bool Qualified = Dot != String::npos;
  TComponent* Base = Qualified ? FindRootComponent(Name.substr(0, Dot)) : FRoot;
  String Rest = Qualified ? Name.substr(Dot + 1) : Name;
  TComponent* Result = Base ? Base->FindComponent(Rest) : nullptr;
  if (!Result && !Qualified) {
    // A bare name may be another module's root.
    Base = FindRootComponent(Name);
    if (Base && CompareText(Base->Name(), Name) == 0) Result = Base;
  }
  if (!Result && Base && CompareText(Base->Name(), Rest) == 0) Result = Base;
  return Result;
}

String TComponentRoot::GetComponentName(TComponent* Component) {
  if (!Component) return "";
  String Name = Component->Name();
  TComponent* Owner = Component->Owner();
  if (Component != FRoot && Owner && Owner != FRoot)
    if (String Path = Owner->GetNamePath(); !Path.empty()) return Path + DotSep + Name;
  return Name;
}

TPersistent* TComponentRoot::GetObject(const String& Name) { return GetComponent(Name); }

String TComponentRoot::GetObjectName(TPersistent* Instance) {
  if (!Instance) return "";
  String Path = Instance->GetNamePath();
  std::size_t Dot = Path.find('.');
  TPersistent* Object = Instance;
  if (Dot == String::npos) {
    Path.clear();
  } else {
    Object = GetComponent(Path.substr(0, Dot));
    if (!Object) return Path;
    Path.erase(0, Dot);
  }
  auto* Component = dynamic_cast<TComponent*>(Object);
  return Component ? GetComponentName(Component) + Path : Instance->GetNamePath();
}

void TComponentRoot::AddImportedRoot(const String& Name) { FImportedRootList.push_back(Name); }

void TComponentRoot::ImportRoots() {
  FImportedRootList.clear();
  if (FModule) FModule->GetComponentNames([this](const String& Name) { AddImportedRoot(Name); });
}

void TComponentRoot::OfferNames(TComponent* Root, const String& Prefix, int Depth, bool IncludeRoot, TClass Wanted,
                                const TGetStrProc& Proc) {
  auto Fits = [Wanted](TComponent* C) { return !C->Name().empty() && (!Wanted || C->InheritsFrom(Wanted)); };
  if (IncludeRoot && Fits(Root)) Proc(Root->Name());
  for (int I = 0; I < Root->ComponentCount(); ++I) {
    TComponent* C = Root->Components(I);
    if (Fits(C)) Proc(Prefix + C->Name());
    // A nested frame offers its own components, one level deep.
    if (Depth == 0 && TRootHooks::IsProxyClass && TRootHooks::IsProxyClass(C->ClassType()))
      OfferNames(C, Prefix + C->Name() + DotSep, 1, false, Wanted, Proc);
  }
}

void TComponentRoot::GetComponentNames(const TTypeData* TypeData, const TGetStrProc& Proc) {
  if (!FRoot) return;
  TClass Wanted = TypeData ? TypeData->ClassRef : nullptr;
  OfferNames(FRoot, "", 0, OffersRootName(), Wanted, Proc);
  auto Clear = Finally([this]() noexcept { FImportedRootList.clear(); });
  ImportRoots();
  TComponent* AncestorRoot = FAncestorRoot ? FAncestorRoot->GetRoot() : nullptr;
  std::vector<String> Names = FImportedRootList; // the host may list again from a callback
  for (const String& Name : Names) {
    IPtr<IRoot> Found;
    if (auto All = Designers())
      All->ForEachDesigner([&](const IPtr<IComponentDesigner>& D) {
        Found = D->FindRoot(Name);
        return !Found;
      });
    TComponent* Linked = Found ? Found->GetRoot() : nullptr;
    if (!Linked || Linked == AncestorRoot) continue;
    auto Internal = QueryAs<IInternalRoot>(Found);
    if (IPtr<ICustomModule> Custom = Internal ? Internal->GetCustomModule() : nullptr; Custom && Custom->Nestable())
      continue;
    OfferNames(Linked, Linked->Name() + DotSep, 1, Linked != FRoot, Wanted, Proc);
  }
}

void TComponentRoot::GetObjectNames(const TTypeData* TypeData, const TGetStrProc& Proc) {
  GetComponentNames(TypeData, Proc);
}

bool TComponentRoot::IsComponentLinkable(TComponent* Component) {
  TComponent* Target = Component ? RootOf(Component) : nullptr;
  if (!Target) return false;
  if (Target == FRoot) return true;
  auto Clear = Finally([this]() noexcept { FImportedRootList.clear(); });
  ImportRoots();
  std::vector<String> Names = FImportedRootList;
  for (const String& Name : Names)
    if (FindRootComponent(Name) == Target) return true;
  return false;
}

void TComponentRoot::MakeComponentLinkable(TComponent* Component) {
  if (!Component) return;
  TComponent* Target = RootOf(Component);
  if (Target && FModule) FModule->MakeComponentLinkable(Target->Name());
}

} // namespace formkit
