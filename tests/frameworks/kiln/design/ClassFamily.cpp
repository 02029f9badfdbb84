//===- tests/frameworks/kiln/design/ClassFamily.cpp - Generated classes and descendants for tests ===//
#include "tests/frameworks/kiln/design/ClassFamily.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit::fakes {

FK_IMPLEMENT(TModuleFamily, "Tests") {}

//===----------------------------------------------------------------------===//
// Generated classes
//===----------------------------------------------------------------------===//

TGeneratedClasses::TGeneratedClasses() {
  TRootHooks::CreateSubClass = [this](TComponent* Instance, const String& ClassName, const String& UnitName,
                                      TClass Parent) { CreateSubClass(Instance, ClassName, UnitName, Parent); };
  TRootHooks::RenameSubClass = [](TComponent* Instance, const String& ClassName, const String& UnitName) {
    TClass Class = GeneratedClassOf(Instance);
    Class->ClassName = ClassName;
    if (!UnitName.empty()) Class->UnitName = UnitName;
  };
  TRootHooks::CreateSubClassMethod = [this](TComponent* Instance, const String& Name) {
    return CreateMethod(Instance, Name);
  };
  TRootHooks::RenameSubClassMethod = [](TComponent* Instance, void* Token, const String& NewName) {
    std::vector<TMethodEntry>& Table = GeneratedClassOf(Instance)->Methods;
    auto It = std::find_if(Table.begin(), Table.end(), [&](const TMethodEntry& M) { return M.Code == Token; });
    if (It != Table.end()) Table.erase(It);
    Table.push_back({NewName, Token, nullptr, nullptr}); // renamed to the end; the token stays
  };
  TRootHooks::DestroySubClassMethod = [](TComponent* Instance, void* Token) {
    std::vector<TMethodEntry>& Table = GeneratedClassOf(Instance)->Methods;
    Table.erase(std::remove_if(Table.begin(), Table.end(), [&](const TMethodEntry& M) { return M.Code == Token; }),
                Table.end());
  };
}

TGeneratedClasses::~TGeneratedClasses() {
  TRootHooks::CreateSubClass = nullptr;
  TRootHooks::RenameSubClass = nullptr;
  TRootHooks::CreateSubClassMethod = nullptr;
  TRootHooks::RenameSubClassMethod = nullptr;
  TRootHooks::DestroySubClassMethod = nullptr;
}

TClass TGeneratedClasses::GeneratedClassOf(TComponent* Instance) {
  TClass Class = Instance->ClassType();
  if (!Class->Generated) throw EComponentDesignerException("The class of " + Instance->Name() + " is not generated");
  return Class;
}

void TGeneratedClasses::CreateSubClass(TComponent* Instance, const String& ClassName, const String& UnitName,
                                       TClass Parent) {
  FRecords.push_back(TClassRec::NewGeneratedClass(Parent, ClassName, UnitName));
  Instance->SetClassType(FRecords.back().get());
}

void* TGeneratedClasses::CreateMethod(TComponent* Instance, const String& Name) {
  if (void* Code = Instance->MethodAddress(Name)) return Code; // here or in a parent
  std::uintptr_t Token = 1;
  while (FTokens.count(Token)) ++Token;
  FTokens.insert(Token);
  void* Code = reinterpret_cast<void*>(Token);
  GeneratedClassOf(Instance)->Methods.push_back({Name, Code, nullptr, nullptr});
  return Code;
}

std::vector<String> TGeneratedClasses::OwnMethods(TComponent* Instance) {
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

TInheritance::TInheritance(TGeneratedClasses& Classes, TCallLog* Log) : FClasses(Classes), FLog(Log) {
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
  TRootHooks::InheritFrom = nullptr;
  TRootHooks::CreateUpdateManager = nullptr;
  TRootHooks::UpdateManagerComponent = nullptr;
  TRootHooks::UpdateManagerNameExists = nullptr;
  TRootHooks::UpdateManagerRenameDescendents = nullptr;
}

void TInheritance::InheritFrom(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor) {
  TComponent* Instance = Root.Root();
  FClasses.CreateSubClass(Instance, ClassName, Root.GetModule()->GetUnitName(), Ancestor->ClassType());
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
