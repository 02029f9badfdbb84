//===- core/root/RootNames.cpp - Names of a module's components ----------===//
#include "core/root/ComponentRoot.h"

#include "core/Events.h"

namespace formkit {

String TComponentRoot::UniqueName(const String& BaseName) {
  // TButton gives the stem Button; a lone T stays.
  String Stem = (BaseName.size() >= 2 && BaseName[0] == 'T') ? BaseName.substr(1, 255) : BaseName;
  bool ThroughDescendants = FRootUpdateManager && TRootHooks::UpdateManagerNameExists;
  for (int I = 1;; ++I) {
    String Candidate = Stem + std::to_string(I);
    bool Taken = ThroughDescendants ? TRootHooks::UpdateManagerNameExists(FRootUpdateManager, Candidate)
                                    : (FRoot && FRoot->FindComponent(Candidate));
    if (!Taken) return Candidate;
  }
}

bool TComponentRoot::IsModifiableFrame(TComponent* Component) const {
  for (TComponent* F : FModifiableFrames)
    if (F == Component) return true;
  return false;
}

void TComponentRoot::ValidateRename(TComponent* Component, const String& CurName, const String& NewName) {
  // A component of a nested frame.
  if (Component && Component != FRoot && Component->Owner() && Component->Owner() != FRoot) {
    TComponentState State = Component->ComponentState();
    if (State.Contains(csAncestor) && !State.Contains(csDestroying) && !CurName.empty() && !FIgnoreRename &&
        !FRevertingComponent && IsModifiableFrame(Component->Owner()))
      throw EComponentDesignerException(sRenamingAncestor, CurName);
    return;
  }
  if (Component == FRoot && FRoot && FRoot->Owner() && FRoot->ComponentState().Contains(csLoading)) return;

  if (Component && Component != FRoot) {
    if (FRootUpdateManager && TRootHooks::UpdateManagerNameExists && CompareText(CurName, NewName) != 0 &&
        TRootHooks::UpdateManagerNameExists(FRootUpdateManager, NewName))
      throw EComponentDesignerException(sComponentAlreadyExists, NewName);
    if (Component->ComponentState().Contains(csAncestor) && !CurName.empty() && !FIgnoreRename && !FRevertingComponent)
      throw EComponentDesignerException(sRenamingAncestor, CurName);
    if (CompareText(NewName, "OWNER") == 0) throw EComponentDesignerException(sComponentAlreadyExists, NewName);
    if (!Component->ComponentState().Contains(csAncestor) &&
        (NewName.empty() || (!FIgnoreRename && Component->Owner() == FRoot)) && FModule)
      FModule->RenameComponent(TCompInfo{CurName, Component->ClassName(), Component->UnitName()}, CurName, NewName);
  } else {
    if (NewName.empty()) throw EComponentDesignerException(sRootMustHaveName);
    String ClassName = "T" + NewName;
    if (FRoot)
      for (TClass C = FRoot->ClassType()->Parent; C; C = C->Parent)
        if (CompareText(C->ClassName, ClassName) == 0) throw EComponentDesignerException(sAncestorClassName, ClassName);
    if (FModule && FRoot)
      FModule->ValidateComponentName(TCompInfo{CurName, FRoot->ClassName(), FRoot->UnitName()}, NewName);
  }
  if (FRoot && !FRoot->ComponentState().Contains(csLoading) && !NewName.empty() &&
      (Component == FRoot || (Component && Component->Owner())))
    FDesigner->UpdateRootDependents();
  if (EvComponentRenamedEvent) EvComponentRenamedEvent->Send(this, CurName, NewName);
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->ComponentRenamed(CurName, NewName);
}

bool TComponentRoot::RenameComponent(const String& CurName, const String& NewName) {
  TComponent* C = FRoot ? FRoot->FindComponent(CurName) : nullptr;
  if (!C) return false;
  C->SetName(NewName);
  return true;
}

} // namespace formkit
