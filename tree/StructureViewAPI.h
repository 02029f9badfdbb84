//===- tree/StructureViewAPI.h - The host's structure view ---------------===//
//
// The interfaces through which the structure tree talks to the host's
// structure view: the view itself, the context it shows (one per module) and
// its nodes, and the data object that carries a drag. The host implements the
// view and offers it through the global service object; the tree implements
// contexts and nodes. Identities are fixed; a later need is a new interface.
//
// Example:
//   if (auto View = IDEService<IOTAStructureView>())
//     if (View->GetCurrentContext().Get() == MyContext.Get()) View->StructureChanged(false);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "core/ToolServices.h"
#include "platform/Streams.h"

namespace formkit {

namespace detail {
/// Runs a host-facing operation that answers: a failure ends it with `Empty` and goes no
/// further. Operations without an answer go through `RunIgnoringExceptions`.
template <class R, class F> R Shielded(R Empty, F&& Fn) noexcept {
  try {
    return Fn();
  } catch (...) {
    return Empty;
  }
}
} // namespace detail

/// One node of the host's structure view; the tree's sprigs stand behind them.
struct FK_API IOTAStructureNode : IInterface {
  FK_INTERFACE(IOTAStructureNode, IInterface, "{5B0A3E51-6C14-4F0E-9C0B-2E7B1D7A4C11}")
  /// The node above this one in the view; null for a top node.
  virtual IPtr<IOTAStructureNode> GetParent() = 0;
};

/// A truth value of the view's operations: 16 bits, -1 for true and 0 for false.
using TOTABool = std::int16_t;
inline constexpr TOTABool OTATrue = -1;
inline constexpr TOTABool OTAFalse = 0;
constexpr TOTABool ToOTABool(bool Value) noexcept { return Value ? OTATrue : OTAFalse; }

/// What the view reads and sets of a node beside its parent.
struct FK_API IOTAStructureNode110 : IOTAStructureNode {
  FK_INTERFACE(IOTAStructureNode110, IOTAStructureNode, "{71C4E0B9-2D83-4F16-9A5E-C08B3D6F1E24}")
  /// The view does not add nodes: -1, nothing added.
  virtual int AddChildNode(const IPtr<IOTAStructureNode>& ANode, int AIndex) = 0;
  virtual String GetCaption() = 0;
  virtual int GetChildCount() = 0;
  virtual IPtr<IOTAStructureNode> GetChild(int AIndex) = 0;
  virtual TOTABool GetExpanded() = 0;
  virtual void SetExpanded(TOTABool AValue) = 0;
  virtual TOTABool GetFocused() = 0;
  virtual void SetFocused(TOTABool AValue) = 0;
  virtual String GetHint() = 0;
  /// The index in the host's image list; -1 for none.
  virtual int GetImageIndex() = 0;
  virtual String GetName() = 0;
  virtual TOTABool GetSelected() = 0;
  virtual void SetSelected(TOTABool AValue) = 0;
  /// The state image in the host's image list; -1 for none.
  virtual int GetStateIndex() = 0;
  /// The host's own value, kept for it.
  virtual std::int32_t GetData() = 0;
  virtual void SetData(std::int32_t AValue) = 0;
  virtual void RemoveChildNode(int AIndex) = 0;
  virtual String GetEditCaption() = 0;
};

/// A node whose children stand in an order of their own.
struct FK_API IOTASortableStructureNode : IInterface {
  FK_INTERFACE(IOTASortableStructureNode, IInterface, "{A5F2803D-7B19-4C6E-8D41-3E6C9B20F7D5}")
  virtual TOTABool GetSortByIndex() = 0;
  virtual int GetItemIndex() = 0;
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

//===----------------------------------------------------------------------===//
// The bridge's side: what a context of sprigs answers the view
//===----------------------------------------------------------------------===//

/// Who keeps the expansion state of the view's nodes.
FK_ENUM(TOTANodePreservationMode, std::uint8_t, onpNone, onpIntegrated, onpExternal)

/// The view's update bracket, its selection's reset and its busy state; a view without
/// them is asked for nothing of the kind.
struct FK_API IOTAStructureView290 : IOTAStructureView280 {
  FK_INTERFACE(IOTAStructureView290, IOTAStructureView280, "{0D3B7E25-6A41-4C8F-9E17-5B2C8A0F6D55}")
  virtual void BeginUpdate() = 0;
  virtual void EndUpdate() = 0;
  /// Unselects every node.
  virtual void ClearSelection() = 0;
  /// True while the view changes its own selection; such changes are not passed on.
  virtual TOTABool GetBusy() = 0;
};

/// One entry of a menu the view and a context hand each other: the view's popup, or the
/// entries a context offers for a node. Truth values are -1 and 0.
struct FK_API IOTAStructureNodeMenuItem : IInterface {
  FK_INTERFACE(IOTAStructureNodeMenuItem, IInterface, "{3B8E5D41-7C26-4A93-9F0E-21D6A4C8B577}")
  /// Removes sub-entry `AIndex`.
  virtual void DeleteItem(int AIndex) = 0;
  virtual String Get_Caption() = 0;
  virtual TOTABool Get_Checked() = 0;
  /// The number of sub-entries.
  virtual int Get_Count() = 0;
  virtual TOTABool Get_Enabled() = 0;
  virtual int Get_GroupIndex() = 0;
  /// The picture in the view's image list; -1 for none.
  virtual int Get_ImageIndex() = 0;
  /// Sub-entry `AIndex`.
  virtual IPtr<IOTAStructureNodeMenuItem> Get_Item(int AIndex) = 0;
  virtual String Get_Name() = 0;
  virtual TOTABool Get_RadioItem() = 0;
  virtual int Get_ShortCut() = 0;
  virtual TOTABool Get_Visible() = 0;
  /// Puts `AItem` in as sub-entry `AIndex`.
  virtual void InsertItem(int AIndex, const IPtr<IOTAStructureNodeMenuItem>& AItem) = 0;
  /// Chooses the entry.
  virtual void Invoke() = 0;
};

/// An entry that may run an action.
struct FK_API IOTAStructureNodeMenuItem290 : IOTAStructureNodeMenuItem {
  FK_INTERFACE(IOTAStructureNodeMenuItem290, IOTAStructureNodeMenuItem, "{9D14A6C3-5E82-4F07-B1A9-C6E3072D48F9}")
  /// The action the entry runs, or null; not owned.
  virtual TComponent* GetAction() = 0;
};

/// A context the view can ask for its identity, its top nodes and what to do with them.
struct FK_API IOTAStructureContext110 : IOTAStructureContext {
  FK_INTERFACE(IOTAStructureContext110, IOTAStructureContext, "{6E2A9D13-0B7C-4F58-8A36-C1D4E9F27B66}")
  virtual String GetContextIdent() = 0;
  virtual String GetStructureType() = 0;
  virtual int GetViewOptions() = 0;
  virtual int GetRootNodeCount() = 0;
  virtual IPtr<IOTAStructureNode> GetRootStructureNode(int AIndex) = 0;
  virtual void NodeEdited(const IPtr<IOTAStructureNode>& ANode) = 0;
  virtual void NodeFocused(const IPtr<IOTAStructureNode>& ANode) = 0;
  /// The view's selection changed; `ANode` is the node that caused it.
  virtual void NodeSelected(const IPtr<IOTAStructureNode>& ANode) = 0;
  /// A double click on `ANode`.
  virtual void DefaultNodeAction(const IPtr<IOTAStructureNode>& ANode) = 0;
  virtual TOTABool SameContext(const IPtr<IOTAStructureContext>& AContext) = 0;
  virtual void AddRootNode(const IPtr<IOTAStructureNode>& ANode, int AIndex) = 0;
  virtual void RemoveRootNode(const IPtr<IOTAStructureNode>& ANode) = 0;
  /// The view shows this context from now on.
  virtual void ContextActivated() = 0;
  /// The view is about to pop `AMenu` up over `ANode`: the context puts its entries at
  /// its top.
  virtual void InitPopupMenu(const IPtr<IOTAStructureNode>& ANode, const IPtr<IOTAStructureNodeMenuItem>& AMenu) = 0;
};

/// Whether the view or the context keeps the nodes' expansion state.
struct FK_API IOTAStructureNodeStatePreserver : IInterface {
  FK_INTERFACE(IOTAStructureNodeStatePreserver, IInterface, "{93C5F1A7-2E48-4B06-B7D9-4A18E6C03F77}")
  virtual TOTANodePreservationMode GetNodePreservationMode() = 0;
  virtual void PreserveNodeStates() = 0;
  virtual void RestoreNodeState(const IPtr<IOTAStructureNode>& ANode) = 0;
};

/// The buttons a context puts on the view's toolbar, by index.
struct FK_API IOTAStructureContextToolbar : IInterface {
  FK_INTERFACE(IOTAStructureContextToolbar, IInterface, "{4B8E0C69-D317-4A2F-85E1-7F30B9A6C288}")
  virtual int GetButtonCount() = 0;
  virtual String GetButtonCaption(int AIndex) = 0;
  virtual TOTABool GetButtonEnabled(int AIndex) = 0;
  virtual TOTABool GetButtonEnableDropDown(int AIndex) = 0;
  virtual TOTABool GetButtonHasDropDown(int AIndex) = 0;
  virtual String GetButtonHint(int AIndex) = 0;
  virtual int GetButtonImageIndex(int AIndex) = 0;
  virtual TOTABool GetButtonSeparator(int AIndex) = 0;
  virtual TOTABool GetButtonVisible(int AIndex) = 0;
  virtual void Invoke(int AIndex) = 0;
};

/// Keys pressed in the view; a handler that uses a key sets it to 0.
struct FK_API IOTAStructureContextKeyHandler : IInterface {
  FK_INTERFACE(IOTAStructureContextKeyHandler, IInterface, "{C71F3B28-95A0-4D6E-A4C3-0E82D5B7F199}")
  /// `AShift` carries the view's shift bits as they are.
  virtual void KeyDown(const IPtr<IOTAStructureNode>& ANode, std::uint16_t AShift, std::uint16_t& AKey) = 0;
  virtual void KeyPressed(const IPtr<IOTAStructureNode>& ANode, char16_t& AKey) = 0;
};

/// The view's edit commands, carried out on its selection.
struct FK_API IOTAStructureContextEditActions : IInterface {
  FK_INTERFACE(IOTAStructureContextEditActions, IInterface, "{2A90D6E4-7C15-4B83-9F62-D8E41A3B50AA}")
  virtual TOTABool EditAction(TEditAction AAction) = 0;
  virtual TEditState GetEditState() = 0;
};

//===----------------------------------------------------------------------===//
// Drag and drop between the view's nodes
//===----------------------------------------------------------------------===//

/// Where a drag is: entering a node, leaving it, or moving over it.
FK_ENUM(TOTADragState, std::uint8_t, odsDragEnter, odsDragLeave, odsDragMove)
/// Where over a node a drop would land.
FK_ENUM(TOTADropMode, std::uint8_t, odmNowhere, odmAbove, odmOnNode, odmBelow)

/// The aspect and the medium of a data object's entry that carries a stream.
inline constexpr int OTAAspectContent = 1;
inline constexpr int OTAMediumStream = 4;
/// The move effect of a drop.
inline constexpr int OTADropEffectMove = 2;

/// One entry of a data object: the clipboard format by name, the aspect, the medium; no
/// target device.
struct TOTAFormatEtc {
  String Format;
  int Aspect = OTAAspectContent;
  int Medium = OTAMediumStream;
};

/// The data object a drag carries: streams by format entry. The platform's object on a
/// desktop; the host supplies it.
struct FK_API IOTADataObject : IInterface {
  FK_INTERFACE(IOTADataObject, IInterface, "{5D27A0C4-8B31-4E9F-A6D2-E03F1B7C4A10}")
  /// Whether an entry of `AFormat` is there.
  virtual bool QueryGetData(const TOTAFormatEtc& AFormat) = 0;
  /// The medium of `AFormat`; null when there is none.
  virtual IPtr<IStream> GetData(const TOTAFormatEtc& AFormat) = 0;
  /// Stores `AMedium` under `AFormat`; with `ARelease` the object holds it from now on.
  /// False when refused.
  virtual bool SetData(const TOTAFormatEtc& AFormat, const IPtr<IStream>& AMedium, bool ARelease) = 0;
};

/// A context whose nodes can be dragged onto one another.
struct FK_API IOTADragStructureContext : IInterface {
  FK_INTERFACE(IOTADragStructureContext, IInterface, "{B84E2F17-3C60-4A95-9D1B-7E25C0A8F321}")
  virtual TOTABool DragAllowed(const IPtr<IOTAStructureNode>& ANode) = 0;
  /// The context's own data object; null: the view makes one.
  virtual IPtr<IOTADataObject> GetDataObject() = 0;
  /// Whether what `ADataObject` carries may be dropped on `ANode`; `AEffect` is the move
  /// effect when it may.
  virtual void DragOver(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject,
                        TOTADragState AState, int AX, int AY, TOTADropMode AMode, int& AEffect, TOTABool& AAccept) = 0;
  virtual void DragDrop(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject, int AFormats,
                        int AX, int AY, TOTADropMode AMode, int& AEffect) = 0;
};

} // namespace formkit
