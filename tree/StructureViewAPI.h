//===- tree/StructureViewAPI.h - The host's structure view ---------------===//
//
// The interfaces through which the structure tree talks to the host's
// structure view: the view itself, the context it shows (one per module) and
// its nodes. The host implements the view and offers it through the global
// service object; the tree implements contexts and nodes. Only the operations
// the tree calls are declared; identities are fixed.
//
// Example:
//   if (auto View = IDEService<IOTAStructureView>())
//     if (View->GetCurrentContext().Get() == MyContext.Get()) View->StructureChanged(false);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ToolServices.h"

namespace formkit {

/// One node of the host's structure view; the tree's sprigs stand behind them.
struct FK_API IOTAStructureNode : IInterface {
  FK_INTERFACE(IOTAStructureNode, IInterface, "{5B0A3E51-6C14-4F0E-9C0B-2E7B1D7A4C11}")
  /// The node above this one in the view; null for a top node.
  virtual IPtr<IOTAStructureNode> GetParent() = 0;
};

/// What the view shows: the tree of one module.
struct FK_API IOTAStructureContext : IInterface {
  FK_INTERFACE(IOTAStructureContext, IInterface, "{8E61F0C2-3D7A-4B59-A1E4-70C93B5D2F22}")
};

/// The host's structure view, offered through `HalvernIDEServices`.
struct FK_API IOTAStructureView : IInterface {
  FK_INTERFACE(IOTAStructureView, IInterface, "{C4D29A73-91B8-4E06-8F3D-1A6E5C7B9033}")
  /// The context shown now; null when none.
  virtual IPtr<IOTAStructureContext> GetCurrentContext() = 0;
  /// The first selected node; null when none is selected.
  virtual IPtr<IOTAStructureNode> GetFirstSelected() = 0;
  /// The selected node after `Node`; null after the last.
  virtual IPtr<IOTAStructureNode> GetNextSelected(const IPtr<IOTAStructureNode>& Node) = 0;
  virtual int GetSelectedCount() = 0;
  /// The context's structure changed; the view rebuilds its nodes.
  virtual void StructureChanged(bool Deferred) = 0;
  /// Selects `Node` in the view.
  virtual void SelectNode(const IPtr<IOTAStructureNode>& Node) = 0;
};

/// The version of the view that takes per-class icons into its image list.
struct FK_API IOTAStructureView280 : IOTAStructureView {
  FK_INTERFACE(IOTAStructureView280, IOTAStructureView, "{2F7E6B14-58C3-4A9D-B6E2-93D04A1C8E44}")
};

} // namespace formkit
