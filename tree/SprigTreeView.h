//===- tree/SprigTreeView.h - A headless tree widget for sprigs ----------===//
//
// The small tree widget that a tree-owning editor shows sprigs in: nodes with
// a text, image, selected-image and state index, an expansion flag and a data
// pointer, owned by their view. A node of the sprig class tells its sprig when
// the widget removes it, so a sprig never keeps a dangling node.
//
// Example:
//   TCustomTreeView View;
//   TTreeNode* Node = View.AddNode(nullptr, "Form1");
//   Node->SetExpanded(true);
//   View.DeleteNode(Node);       // frees its children too
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"

#include <vector>

namespace formkit {

class TCustomTreeView;

/// One node of a `TCustomTreeView`; owned by the view.
class FK_API TTreeNode : public TObject {
  FK_CLASS(TTreeNode, TObject)
  TTreeNode() = default;

  String Text;
  int ImageIndex = -1;
  int SelectedIndex = -1;
  int StateIndex = -1;
  /// Free for the node's user: a sprig node points back at its sprig here.
  void* Data = nullptr;

  TCustomTreeView* TreeView() const noexcept { return FView; }
  TTreeNode* Parent() const noexcept { return FParent; }
  int Count() const noexcept { return static_cast<int>(FChildren.size()); }
  TTreeNode* Item(int Index) const { return FChildren.at(static_cast<std::size_t>(Index)); }
  bool Expanded() const noexcept { return FExpanded; }
  void SetExpanded(bool Value) noexcept { FExpanded = Value; }
  /// True when every node above this one is expanded.
  bool IsVisible() const noexcept;

  /// Frees the children, last first, and leaves the parent's list.
  void BeforeDestruction() override;

private:
  friend class TCustomTreeView;
  TCustomTreeView* FView = nullptr;
  TTreeNode* FParent = nullptr;
  std::vector<TTreeNode*> FChildren; // owned
  bool FExpanded = false;
};

/// The headless tree widget: a forest of owned nodes.
class FK_API TCustomTreeView : public TObject {
  FK_CLASS(TCustomTreeView, TObject)
  TCustomTreeView() = default;

  /// A new node of `NodeClass` (a `TTreeNode` class; null for `TTreeNode`) at the end of
  /// `Parent`'s children, or of the top nodes when `Parent` is null.
  TTreeNode* AddNode(TTreeNode* Parent, const String& Text, TClass NodeClass = nullptr);
  /// Frees `Node` with its subtree.
  void DeleteNode(TTreeNode* Node);
  int TopCount() const noexcept { return static_cast<int>(FTop.size()); }
  TTreeNode* Top(int Index) const { return FTop.at(static_cast<std::size_t>(Index)); }
  /// True while the view frees its nodes in its own teardown.
  bool IsDestroying() const noexcept { return FDestroying; }
  void BeforeDestruction() override;

private:
  friend class TTreeNode;
  std::vector<TTreeNode*> FTop; // owned
  bool FDestroying = false;
};

} // namespace formkit
