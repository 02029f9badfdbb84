//===- core/root/RootCompInfo.cpp - The events of an object, for the host ===//
#include "core/root/ComponentRoot.h"

namespace formkit {

FK_IMPLEMENT(TCompInfo, "ComponentDesigner") {}

namespace {

void CheckIndex(int Index, std::size_t Count) {
  if (Index < 0 || static_cast<std::size_t>(Index) >= Count) throw EListError(SListIndexError, Index);
}

/// Whether a class-typed property leads to an object with events of its own: a persistent
/// that is no component, or a component that is the holder's sub-component.
bool LeadsToSubObject(TPersistent* Instance, PPropInfo Prop) {
  TClass Class = GetObjectPropClass(Prop);
  if (!Class || !Class->InheritsFrom(TPersistent::StaticClass())) return false;
  if (!Class->InheritsFrom(TComponent::StaticClass())) return true;
  auto* Value = dynamic_cast<TComponent*>(GetObjectProp(Instance, Prop));
  return Value && Value->ComponentStyle().Contains(csSubComponent);
}

} // namespace

TCompInfo::TCompInfo(const IPtr<IInternalRoot>& Root, TPersistent* Instance) : FRoot(Root), FInstance(Instance) {
  GetPropList(Instance->ClassType()->TypeInfo(), tkMethods, &FList, true);
}

PPropInfo TCompInfo::GetEventInfo(int Index) {
  CheckIndex(Index, FList.size());
  return FList[static_cast<std::size_t>(Index)];
}

IPtr<IEventInfo> TCompInfo::GetIEventInfo(int Index) { return NewAs<IEventInfo, TEventInfo>(GetEventInfo(Index)); }

String TCompInfo::GetEventValue(int Index) {
  TMethod Method = GetMethodProp(FInstance, GetEventInfo(Index));
  TComponent* Root = FRoot ? FRoot->GetRoot() : nullptr;
  if (!Method.Code || !Root || Method.Data != static_cast<void*>(static_cast<TObject*>(Root))) return "";
  return Root->MethodName(Method.Code);
}

void TCompInfo::ClearEvent(int Index) {
  PPropInfo Prop = GetEventInfo(Index);
  auto* Root = FRoot ? dynamic_cast<TComponentRoot*>(FRoot->Implementor()) : nullptr;
  if (Root && Root->CanRevert(FInstance, Prop)) Root->Revert(FInstance, Prop);
  else SetMethodProp(FInstance, Prop, TMethod{});
  if (IPtr<IDesigner> Designer = FRoot ? FRoot->GetDesigner() : nullptr) Designer->Modified();
}

IPtr<IDesignObject> TCompInfo::GetComponentHandle() { return PersistentToDesignObject(FInstance); }

void TCompInfo::InitSubList() {
  std::vector<PPropInfo> Classes;
  GetPropList(FInstance->ClassType()->TypeInfo(), TTypeKinds{tkClass}, &Classes, true);
  for (PPropInfo Prop : Classes)
    if (LeadsToSubObject(FInstance, Prop)) FSubList.push_back(Prop);
  FSubCount = static_cast<int>(FSubList.size());
}

int TCompInfo::GetSubInfoCount() {
  if (FSubCount < 0) InitSubList();
  auto* Collection = dynamic_cast<TCollection*>(FInstance);
  return FSubCount + (Collection ? Collection->Count() : 0);
}

IPtr<ICompInfo> TCompInfo::GetSubInfo(int Index) {
  int Count = GetSubInfoCount();
  CheckIndex(Index, static_cast<std::size_t>(Count));
  TPersistent* Sub = nullptr;
  if (Index < FSubCount) Sub = dynamic_cast<TPersistent*>(GetObjectProp(FInstance, FSubList[static_cast<std::size_t>(Index)]));
  else Sub = static_cast<TCollection*>(FInstance)->Items(Index - FSubCount);
  return Sub ? NewAs<ICompInfo, TCompInfo>(FRoot, Sub) : nullptr;
}

//===----------------------------------------------------------------------===//
// The state of one paste
//===----------------------------------------------------------------------===//

void TRenames::Rename(String& Name) const {
  for (const TRenameItem& Item : FList)
    if (CompareText(Item.Source, Name) == 0) {
      Name = Item.Target;
      return;
    }
}

const TRenameItem& TRenames::GetItems(int Index) const {
  CheckIndex(Index, FList.size());
  return FList[static_cast<std::size_t>(Index)];
}

TEventItem& TEvents::GetItems(int Index) {
  CheckIndex(Index, FList.size());
  return FList[static_cast<std::size_t>(Index)];
}

TEventItem* TEvents::Find(const String& Name) {
  for (TEventItem& Item : FList)
    if (CompareText(Item.OriginalName, Name) == 0) return &Item;
  return nullptr;
}

} // namespace formkit
