//===- tests/frameworks/kiln/design/ClassFamily.cpp - Descendant modules for tests ===//
#include "tests/frameworks/kiln/design/ClassFamily.h"

#include "inheritance/Proxies.h"
#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit::fakes {

FK_IMPLEMENT(TModuleFamily, "Tests") {}

std::vector<String> OwnMethods(TComponent* Instance) {
  std::vector<String> Names;
  for (const TMethodEntry& M : Instance->ClassType()->Methods) Names.push_back(M.Name);
  return Names;
}

//===----------------------------------------------------------------------===//
// The family of modules
//===----------------------------------------------------------------------===//

TModuleFamily::TModuleFamily(TComponentRoot* Root, TModuleFamily* Parent, TCallLog* Log)
    : FRoot(Root), FParent(Parent), FLog(Log) {
  if (FParent) FParent->FChildren.push_back(this);
}

void TModuleFamily::BeforeDestruction() {
  if (FParent) FParent->FChildren.erase(std::find(FParent->FChildren.begin(), FParent->FChildren.end(), this));
  for (TModuleFamily* Child : FChildren) Child->FParent = nullptr;
  FChildren.clear();
  inherited::BeforeDestruction();
}

bool TModuleFamily::NameExists(const String& Name) const {
  if (GetComponent() && GetComponent()->FindComponent(Name)) return true;
  return std::any_of(FChildren.begin(), FChildren.end(), [&](TModuleFamily* C) { return C->NameExists(Name); });
}

int TModuleFamily::DescendantCount() const {
  int Count = 0;
  for (TModuleFamily* C : FChildren) Count += 1 + C->DescendantCount();
  return Count;
}

void TModuleFamily::RenameDescendents(const String& CurName, const String& NewName) {
  if (FLog) FLog->Add("RenameDescendents(" + FRoot->GetRootName() + "," + CurName + "," + NewName + ")");
  std::vector<TModuleFamily*> Children = FChildren;
  for (TModuleFamily* Child : Children) Child->RenameComponent(CurName, NewName);
}

void TModuleFamily::RenameComponent(const String& CurName, const String& NewName) {
  TComponent* Component = GetComponent() ? GetComponent()->FindComponent(CurName) : nullptr;
  if (Component && Component->ComponentState().Contains(csAncestor)) {
    IPtr<IUpdateManager> Self(this);
    FRoot->Updating(Self);
    auto End = Finally([&]() noexcept { RunIgnoringExceptions([&] { FRoot->Updated(Self); }); });
    Component->SetName(NewName);
  }
  RenameDescendents(CurName, NewName);
}

//===----------------------------------------------------------------------===//
// Inheritance
//===----------------------------------------------------------------------===//

TModuleFamily* TInheritance::FamilyOf(const IPtr<IUpdateManager>& Manager) {
  return dynamic_cast<TModuleFamily*>(Manager.Get());
}

TInheritance::TInheritance(TCallLog* Log) : FLog(Log) {
  FSaved.InheritFrom = TRootHooks::InheritFrom;
  FSaved.CreateUpdateManager = TRootHooks::CreateUpdateManager;
  FSaved.UpdateManagerComponent = TRootHooks::UpdateManagerComponent;
  FSaved.UpdateManagerNameExists = TRootHooks::UpdateManagerNameExists;
  FSaved.UpdateManagerRenameDescendents = TRootHooks::UpdateManagerRenameDescendents;
  FSaved.UpdateManagerModified = TRootHooks::UpdateManagerModified;
  FSaved.UpdateManagerRemoved = TRootHooks::UpdateManagerRemoved;
  FSaved.UpdateManagerCanRevert = TRootHooks::UpdateManagerCanRevert;
  FSaved.UpdateManagerRevert = TRootHooks::UpdateManagerRevert;
  // The stand-in family answers only for names and renames.
  TRootHooks::UpdateManagerModified = nullptr;
  TRootHooks::UpdateManagerRemoved = nullptr;
  TRootHooks::UpdateManagerCanRevert = nullptr;
  TRootHooks::UpdateManagerRevert = nullptr;
  TRootHooks::InheritFrom = [this](TComponentRoot& Root, const String& ClassName, TComponent* Ancestor) {
    InheritFrom(Root, ClassName, Ancestor);
  };
  TRootHooks::CreateUpdateManager = [this](TComponentRoot& Root, TComponent*, TComponent*,
                                           const IPtr<IUpdateManager>& AncestorManager) {
    return NewAs<IUpdateManager, TModuleFamily>(&Root, FamilyOf(AncestorManager), FLog);
  };
  TRootHooks::UpdateManagerComponent = [](const IPtr<IUpdateManager>& M) { return FamilyOf(M)->GetComponent(); };
  TRootHooks::UpdateManagerNameExists = [](const IPtr<IUpdateManager>& M, const String& Name) {
    return FamilyOf(M)->NameExists(Name);
  };
  TRootHooks::UpdateManagerRenameDescendents = [](const IPtr<IUpdateManager>& M, const String& Cur,
                                                  const String& New) { FamilyOf(M)->RenameDescendents(Cur, New); };
}

TInheritance::~TInheritance() {
  TRootHooks::InheritFrom = FSaved.InheritFrom;
  TRootHooks::CreateUpdateManager = FSaved.CreateUpdateManager;
  TRootHooks::UpdateManagerComponent = FSaved.UpdateManagerComponent;
  TRootHooks::UpdateManagerNameExists = FSaved.UpdateManagerNameExists;
  TRootHooks::UpdateManagerRenameDescendents = FSaved.UpdateManagerRenameDescendents;
  TRootHooks::UpdateManagerModified = FSaved.UpdateManagerModified;
  TRootHooks::UpdateManagerRemoved = FSaved.UpdateManagerRemoved;
  TRootHooks::UpdateManagerCanRevert = FSaved.UpdateManagerCanRevert;
  TRootHooks::UpdateManagerRevert = FSaved.UpdateManagerRevert;
}

void TInheritance::InheritFrom(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor) {
  TComponent* Instance = Root.Root();
  formkit::CreateSubClass(Instance, ClassName, Root.GetModule()->GetUnitName(), Ancestor->ClassType());
  // The descendant starts as a full image of its ancestor.
  TObjectGuard<TMemoryStream> Image(new TMemoryStream);
  {
    TObjectGuard<TWriter> Writer(new TWriter(Image.Get(), 4096));
    Writer->WriteDescendent(Ancestor, nullptr);
  }
  Image->SetPosition(0);
  TObjectGuard<TReader> Reader(new TReader(Image.Get(), 4096));
  Reader->OnFindMethod = TFindMethodEvent::Bind<&TComponentRoot::FindObjectMethod>(&Root);
  Reader->ReadRootComponent(Instance);
}

} // namespace formkit::fakes
