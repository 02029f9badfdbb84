//===- editors/CustomModule.cpp - The base of custom modules -------------===//
#include "editors/CustomModule.h"

#include "inheritance/Proxies.h"

namespace formkit {

FK_IMPLEMENT(TCustomModule, "DesignEditors") {}

void TCustomModule::Create(TComponent* ARoot, const IPtr<IDesigner>& ADesigner) {
  inherited::Create(ARoot, ADesigner);
  FRoot = ARoot;
  FDesigner = ADesigner;
}

void TCustomModule::BeforeDestruction() {
  FFinder.Reset();
  inherited::BeforeDestruction();
}

TClass TCustomModule::GetFinderClass() {
  if (!FRoot) return nullptr;
  return FRoot->Owner() ? FRoot->Owner()->ClassType() : FRoot->ClassType();
}

bool TCustomModule::ValidateComponentClass(TClass ComponentClass) {
  TClass Finder = GetFinderClass();
  if (!FFinder || FFinder->ForClass() != Finder) FFinder.Reset(new TClassFinder(Finder, false));
  while (ComponentClass && IsProxyClass(ComponentClass)) ComponentClass = ComponentClass->Parent;
  return ComponentClass && FFinder->GetClass(ComponentClass->ClassName) == ComponentClass;
}

void TCustomModule::ValidateComponent(TComponent* Component) {
  if (!ValidateComponentClass(Component->ClassType()))
    throw ENonAIRException(sClassNotApplicable, Component->ClassName());
}

bool ClassInheritsFrom(TClass ClassType, const String& ClassName) {
  for (TClass C = ClassType; C; C = C->Parent)
    if (SameText(C->ClassName, ClassName)) return true;
  return false;
}

bool AncestorNameMatches(TClass ClassType, TClass AncestorClass) {
  if (ClassType->InheritsFrom(AncestorClass)) return true;
  return !ClassInheritsFrom(ClassType, AncestorClass->ClassName);
}

} // namespace formkit
