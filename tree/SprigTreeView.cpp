//===- tree/SprigTreeView.cpp - A headless tree widget for sprigs --------===//
#include "tree/SprigTreeView.h"

#include "platform/TypInfoBuilder.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TTreeNode, "SprigTreeView") {}
FK_IMPLEMENT(TCustomTreeView, "SprigTreeView") {}

namespace {
FK_RESOURCESTRING(SNotATreeNodeClass, "%s is not a tree node class");

/// Frees the nodes of `List` from the last; each leaves the list as it goes.
void FreeNodes(std::vector<TTreeNode*>& List) {
  while (!List.empty()) List.back()->Destroy();
}
} // namespace

bool TTreeNode::IsVisible() const noexcept {
  for (const TTreeNode* P = FParent; P; P = P->FParent)
    if (!P->FExpanded) return false;
  return true;
}

void TTreeNode::BeforeDestruction() {
  FreeNodes(FChildren);
  if (FView) {
    std::vector<TTreeNode*>& Siblings = FParent ? FParent->FChildren : FView->FTop;
    std::erase(Siblings, this);
  }
  FParent = nullptr;
  inherited::BeforeDestruction();
}

TTreeNode* TCustomTreeView::AddNode(TTreeNode* Parent, const String& Text, TClass NodeClass) {
  TClass Class = NodeClass ? NodeClass : TTreeNode::StaticClass();
  if (!Class->InheritsFrom(TTreeNode::StaticClass()))
    throw EInvalidOperation(SNotATreeNodeClass, Class->ClassName);
  TObjectGuard<TTreeNode> Node(static_cast<TTreeNode*>(Class->NewInstance()));
  Node->Text = Text;
  Node->FView = this;
  Node->FParent = Parent;
  (Parent ? Parent->FChildren : FTop).push_back(Node.Get());
  return Node.Release();
}

void TCustomTreeView::DeleteNode(TTreeNode* Node) {
  if (Node) Node->Destroy();
}

void TCustomTreeView::BeforeDestruction() {
  FDestroying = true;
  FreeNodes(FTop);
  inherited::BeforeDestruction();
}

} // namespace formkit
