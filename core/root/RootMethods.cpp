//===- core/root/RootMethods.cpp - Handlers bound to methods of the module ===//
//
// A designed class has no compiled code: its methods are text in the host's
// source and tokens in the root's generated class. A bound event holds the
// token as its code and the root component as its data. The host is asked for
// the text; the generated classes give and rename the tokens.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "platform/Filer.h"

namespace formkit {

const char* const TComponentRoot::AddingMethod = "Adding a method to the designed class";

void TComponentRoot::RequireClassMethods(const char* Service) {
  if (!TRootHooks::CreateSubClassMethod || !TRootHooks::RenameSubClassMethod || !TRootHooks::DestroySubClassMethod)
    RaiseServiceNotAvailable(Service);
}

TMethod TComponentRoot::CreateMethod(const String& Name, const TTypeData* TypeData) {
  return CreateMethod(Name, NewAs<IEventInfo, TEventInfo>(TypeData));
}

TMethod TComponentRoot::CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) {
  if (Name.empty()) return {};
  if (FModule) {
    FModule->CheckWritable();
    FModule->CreateMethod(Name, EventInfo);
  }
  RequireClassMethods(AddingMethod);
  // A method the class has already keeps its code.
  return TMethod{TRootHooks::CreateSubClassMethod(FRoot, Name), static_cast<TObject*>(FRoot)};
}

String TComponentRoot::GetMethodName(const TMethod& Method) {
  if (!Method.Code || !FRoot || Method.Data != static_cast<void*>(static_cast<TObject*>(FRoot))) return "";
  return FRoot->MethodName(Method.Code);
}

void TComponentRoot::GetMethods(const TTypeData* TypeData, const TGetStrProc& Proc) {
  GetMethods(NewAs<IEventInfo, TEventInfo>(TypeData), Proc);
}

void TComponentRoot::GetMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) {
  if (FModule) FModule->GetMethods(EventInfo, Proc);
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
  ChainCall(MethodName, InstanceName, InstanceMethod, NewAs<IEventInfo, TEventInfo>(TypeData));
}

void TComponentRoot::ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                               const IPtr<IEventInfo>& EventInfo) {
  if (FModule) FModule->ChainCall(MethodName, InstanceName, InstanceMethod, EventInfo);
}

bool TComponentRoot::MethodFromAncestor(const TMethod& Method) {
  // Inherited when the parent of the module's class knows the code.
  TClass Parent = FRoot ? FRoot->ClassType()->Parent : nullptr;
  return Parent && !Parent->MethodName(Method.Code).empty();
}

void TComponentRoot::RenameRootMethod(const String& CurName, const String& NewName) {
  void* Address = FRoot ? FRoot->MethodAddress(CurName) : nullptr;
  if (!Address) return;
  RequireClassMethods("Renaming a method of the designed class");
  TRootHooks::RenameSubClassMethod(FRoot, Address, NewName);
  Modified();
}

void TComponentRoot::FindObjectMethod(TReader* Reader, const String& MethodName, void*& Address, bool& Error) {
  if (Address || Reader->Root() != FRoot) return;
  RequireClassMethods(AddingMethod);
  Address = TRootHooks::CreateSubClassMethod(FRoot, MethodName);
  Error = false;
}

//===----------------------------------------------------------------------===//
// Going back to the ancestor's value
//===----------------------------------------------------------------------===//

bool TComponentRoot::CanRevert(TPersistent* Instance, PPropInfo PropInfo) {
  if (!TRootHooks::UpdateManagerCanRevert) return false;
  if (FRootUpdateManager && TRootHooks::UpdateManagerCanRevert(FRootUpdateManager, Instance, PropInfo)) return true;
  for (int I = 0; FUpdateManagers && I < FUpdateManagers->GetCount(); ++I)
    if (TRootHooks::UpdateManagerCanRevert(QueryAs<IUpdateManager>(FUpdateManagers->Get(I)), Instance, PropInfo))
      return true;
  return false;
}

void TComponentRoot::Revert(TPersistent* Instance, PPropInfo PropInfo) {
  // Without inheritance support nothing differs from an ancestor.
  if (!TRootHooks::UpdateManagerCanRevert || !TRootHooks::UpdateManagerRevert) return;
  bool Reverted = false;
  if (FRootUpdateManager && TRootHooks::UpdateManagerCanRevert(FRootUpdateManager, Instance, PropInfo)) {
    TRootHooks::UpdateManagerRevert(FRootUpdateManager, Instance, PropInfo);
    Reverted = true;
  } else {
    for (int I = 0; FUpdateManagers && I < FUpdateManagers->GetCount(); ++I) {
      auto Manager = QueryAs<IUpdateManager>(FUpdateManagers->Get(I));
      if (!TRootHooks::UpdateManagerCanRevert(Manager, Instance, PropInfo)) continue;
      TRootHooks::UpdateManagerRevert(Manager, Instance, PropInfo);
      Reverted = true;
    }
  }
  if (Reverted) Modified();
}

} // namespace formkit
