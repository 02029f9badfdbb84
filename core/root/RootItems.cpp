//===- core/root/RootItems.cpp - Items a root makes itself ---------------===//
#include "core/root/RootItems.h"

#include "core/root/ComponentRoot.h"

namespace formkit {

FK_IMPLEMENT(TInternalItem, "ComponentDesigner") {}
FK_IMPLEMENT(TComponentItem, "ComponentDesigner") {}
FK_IMPLEMENT(TNonControlItem, "ComponentDesigner") {}

TInternalItem::TInternalItem(TPersistent* Instance, const IPtr<IDesigner>& Designer)
    : TPersistentItem(Instance), FInternalRoot(QueryAs<IInternalRoot>(Designer)), FDesigner(Designer) {}

IPtr<IComponentEditor> TInternalItem::GetEditor() {
  if (!FEditor && TRootHooks::GetComponentEditor)
    if (auto* Component = dynamic_cast<TComponent*>(FInstance)) FEditor = TRootHooks::GetComponentEditor(Component, FDesigner);
  return FEditor;
}

void TInternalItem::Edit() {
  if (IPtr<IComponentEditor> Editor = GetEditor()) Editor->Edit();
}

bool TComponentItem::Selectable() {
  TComponent* C = GetComponent();
  if (!C) return false;
  TComponent* Root = FDesigner ? FDesigner->GetRoot() : nullptr;
  if (C == Root || !C->Owner() || C->Owner() == Root) return true;
  auto* RootObject = FInternalRoot ? dynamic_cast<TComponentRoot*>(FInternalRoot->Implementor()) : nullptr;
  return RootObject && RootObject->ModifiableFrame(C->Owner());
}

void TComponentItem::ValidateDeletable() {
  TComponent* C = GetComponent();
  if (C && C->ComponentState().Contains(csAncestor)) throw EComponentDesignerException(sCantDeleteAncestor, C->Name());
}

void TNonControlItem::ValidateDeletable() {
  if (GetComponent()) TComponentItem::ValidateDeletable();
  throw ECannotDeleteNonComponentException(sCannotDeleteNonComponent);
}

} // namespace formkit
