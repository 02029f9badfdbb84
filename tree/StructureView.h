//===- tree/StructureView.h - The tree behind the host's structure view --===//
//
// Adapters that put a tree of sprigs behind the host's structure view: a node
// for each shown sprig and one context for each module's tree. The context
// keeps the designer's selection and the view's in step both ways, under a
// select lock that stops the echo, and holds back an empty view selection
// until the application is idle. It also answers the view's toolbar, delete
// key and edit commands. Host-facing operations let no exception out: a
// failure gives the operation's empty answer.
//
// Example:
//   InstallStructureViewBridge();              // tree changes reach the contexts
//   IPtr<IOTAStructureContext> Context = StructureContextFor(Root);
//   // The host shows `Context`; its view then calls NodeSelected, KeyDown,
//   // DragOver and DragDrop, and binds its idle event to Idle.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tree/RootSprig.h"
#include "tree/StructureMenus.h"

namespace formkit {

class TSprigStructureNode;

namespace detail {
/// Linked to one sprig; when the sprig goes, its adapter forgets it. Owned by the
/// adapter.
class FK_API TSprigWatch : public TInformant {
  FK_CLASS(TSprigWatch, TInformant)
  TSprigWatch() = default;
  explicit TSprigWatch(TSprigStructureNode* ANode) : FNode(ANode) {}
  void Changed(TInformant* ASender) override;

private:
  TSprigStructureNode* FNode = nullptr;
};
} // namespace detail

//===----------------------------------------------------------------------===//
// Nodes
//===----------------------------------------------------------------------===//

/// The view's node of one sprig. Lives as long as the sprig or the host holds it; the
/// back link breaks by itself when the sprig goes. Does not own the sprig.
/// Without a sprig the strings are empty, counts 0, indices -1 and nodes null.
class FK_API TSprigStructureNode : public TInterfacedObject,
                                   public IOTAStructureNode110,
                                   public IOTASortableStructureNode,
                                   public ISprig {
  FK_CLASS(TSprigStructureNode, TInterfacedObject)
  FK_INTERFACES(IOTAStructureNode110, IOTASortableStructureNode, ISprig)
  explicit TSprigStructureNode(TSprig* ASprig = nullptr);
  void BeforeDestruction() override;

  /// The node of the sprig's parent; null at the top or without a sprig.
  IPtr<IOTAStructureNode> GetParent() override;
  TSprig* GetSprig() override { return FSprig; }
  /// Forgets the sprig; the adapter answers empty from now on.
  virtual void ClearSprig() noexcept;

  // IOTAStructureNode110: the sprig's answers ------------------------------------------
  int AddChildNode(const IPtr<IOTAStructureNode>&, int) override { return -1; }
  String GetCaption() override;
  int GetChildCount() override;
  IPtr<IOTAStructureNode> GetChild(int AIndex) override;
  TOTABool GetExpanded() override;
  void SetExpanded(TOTABool AValue) override;
  TOTABool GetFocused() override { return ToOTABool(FFocused); }
  void SetFocused(TOTABool AValue) override { FFocused = AValue != OTAFalse; }
  String GetHint() override;
  /// The sprig's image plus `GImageOffset`; -1 while the offset is negative.
  int GetImageIndex() override;
  String GetName() override;
  TOTABool GetSelected() override { return ToOTABool(FSelected); }
  void SetSelected(TOTABool AValue) override { FSelected = AValue != OTAFalse; }
  /// No state is -1; another state is offset by `GStateImageOffset`, -1 without one.
  int GetStateIndex() override;
  std::int32_t GetData() override { return FData; }
  void SetData(std::int32_t AValue) override { FData = AValue; }
  void RemoveChildNode(int) override {}
  String GetEditCaption() override { return GetCaption(); }
  TOTABool GetSortByIndex() override;
  int GetItemIndex() override;

private:
  TSprig* FSprig;
  std::int32_t FData = 0;
  bool FSelected = false;
  bool FFocused = false;
  TObjectGuard<detail::TSprigWatch> FWatch;
};

/// The node of a root sprig: its parent is the context of its tree.
class FK_API TRootSprigStructureNode : public TSprigStructureNode {
  FK_CLASS(TRootSprigStructureNode, TSprigStructureNode)
  using TSprigStructureNode::TSprigStructureNode;
  IPtr<IOTAStructureNode> GetParent() override;
};

/// The node of `ASprig` in the view, made at the first request and kept by the sprig;
/// null for no sprig or an invalid one.
FK_API IPtr<IOTAStructureNode> StructureNodeFor(TSprig* ASprig);

//===----------------------------------------------------------------------===//
// The drag payload
//===----------------------------------------------------------------------===//

/// The sprigs a drag in the view carries, by reference inside the process.
struct FK_API IInternalDragSprigs : IInterface {
  FK_INTERFACE(IInternalDragSprigs, IInterface, "{E3A51C92-6F0D-4B78-8C24-19D7B5E06A3F}")
  virtual void Add(TSprig* ASprig) = 0;
  virtual int Count() = 0;
  virtual TSprig* Sprigs(int AIndex) = 0;
  virtual void Remove(TSprig* ASprig) = 0;
};

/// The payload: a stream only so that it rides in a data object in a stream's place; the
/// stream stays empty. Does not own the sprigs, which must outlive the drag.
class FK_API TInternalDragSprigs : public TStreamAdapter, public IInternalDragSprigs {
  FK_CLASS(TInternalDragSprigs, TStreamAdapter)
  FK_INTERFACES(IInternalDragSprigs)
  TInternalDragSprigs();
  void Add(TSprig* ASprig) override { FDragSprigs.push_back(ASprig); }
  int Count() override { return static_cast<int>(FDragSprigs.size()); }
  /// The sprig at `AIndex`; null out of range.
  TSprig* Sprigs(int AIndex) override;
  void Remove(TSprig* ASprig) override;

private:
  std::vector<TSprig*> FDragSprigs;
};

/// The data object entry of the payload: the format "Halvern.Sprig" as a stream.
FK_API TOTAFormatEtc SprigFormatEtc();

//===----------------------------------------------------------------------===//
// The context of one module
//===----------------------------------------------------------------------===//

/// What the view shows for one module's tree. Registered as a design notification while
/// its root lives; does not own the root.
class FK_API TRootSprigStructureContext : public TSprigStructureNode,
                                          public IOTAStructureContext110,
                                          public IOTAStructureNodeStatePreserver,
                                          public IOTAStructureContextToolbar,
                                          public IOTAStructureContextKeyHandler,
                                          public IOTAStructureContextEditActions,
                                          public IOTADragStructureContext,
                                          public IDesignNotification {
  FK_CLASS(TRootSprigStructureContext, TSprigStructureNode)
  FK_INTERFACES(IOTAStructureContext110, IOTAStructureNodeStatePreserver,
                IOTAStructureContextToolbar, IOTAStructureContextKeyHandler, IOTAStructureContextEditActions,
                IOTADragStructureContext, IDesignNotification)
  explicit TRootSprigStructureContext(TRootSprig* ARootSprig);

  /// The context is the view's top node; its one child is the root's node.
  IPtr<IOTAStructureNode> GetParent() override { return nullptr; }
  int GetChildCount() override { return FRootSprig ? 1 : 0; }
  IPtr<IOTAStructureNode> GetChild(int AIndex) override;
  TRootSprig* RootSprig() const noexcept { return FRootSprig; }
  /// The root is going: forget it and stop hearing the designers.
  void ClearSprig() noexcept override;

  // IOTAStructureContext110 -----------------------------------------------------
  String GetContextIdent() override;
  String GetStructureType() override;
  int GetViewOptions() override { return 2; }
  int GetRootNodeCount() override { return FRootSprig ? 1 : 0; }
  /// This context, repopulated first when the tree needs it; null without a root.
  IPtr<IOTAStructureNode> GetRootStructureNode(int AIndex) override;
  void NodeEdited(const IPtr<IOTAStructureNode>&) override {}
  void NodeFocused(const IPtr<IOTAStructureNode>&) override {}
  /// Carries the view's selection to the designer; an empty one waits for `Idle`.
  void NodeSelected(const IPtr<IOTAStructureNode>& ANode) override;
  /// Edits the one selected node's component through the designer.
  void DefaultNodeAction(const IPtr<IOTAStructureNode>& ANode) override;
  TOTABool SameContext(const IPtr<IOTAStructureContext>& AContext) override;
  void AddRootNode(const IPtr<IOTAStructureNode>&, int) override {}
  void RemoveRootNode(const IPtr<IOTAStructureNode>&) override {}
  /// Gives the view the designer's selection.
  void ContextActivated() override;
  /// Puts the designer's local menu for `ANode`, with the sprig's entries and its add
  /// types above a separator, at the top of `AMenu`; keeps the popup built until the next.
  void InitPopupMenu(const IPtr<IOTAStructureNode>& ANode, const IPtr<IOTAStructureNodeMenuItem>& AMenu) override;
  /// An add-type entry was chosen: the root sprig adds the type of the entry's tag.
  void HandleAddType(TObject* ASender);
  /// The popup `InitPopupMenu` built last; null before the first.
  const IPtr<IPopupMenu>& LastPopup() const noexcept { return FLastPopup; }

  // IOTAStructureNodeStatePreserver: the sprigs keep the expansion state --------
  TOTANodePreservationMode GetNodePreservationMode() override { return onpIntegrated; }
  void PreserveNodeStates() override {}
  void RestoreNodeState(const IPtr<IOTAStructureNode>&) override {}

  // IOTAStructureContextToolbar: Add, Delete, a separator, Up, Down ------------------
  int GetButtonCount() override { return 5; }
  String GetButtonCaption(int AIndex) override;
  TOTABool GetButtonEnabled(int AIndex) override;
  TOTABool GetButtonEnableDropDown(int AIndex) override { return GetButtonHasDropDown(AIndex); }
  TOTABool GetButtonHasDropDown(int AIndex) override;
  String GetButtonHint(int AIndex) override;
  int GetButtonImageIndex(int AIndex) override;
  TOTABool GetButtonSeparator(int AIndex) override { return ToOTABool(AIndex == 2); }
  TOTABool GetButtonVisible(int) override { return OTATrue; }
  void Invoke(int AIndex) override;

  // IOTAStructureContextKeyHandler ---------------------------------------------------
  /// The delete key without the modifiers of mask 12 deletes when deleting is allowed,
  /// and is then used up.
  void KeyDown(const IPtr<IOTAStructureNode>& ANode, std::uint16_t AShift, std::uint16_t& AKey) override;
  void KeyPressed(const IPtr<IOTAStructureNode>&, char16_t&) override {}

  // IOTAStructureContextEditActions --------------------------------------------------
  TOTABool EditAction(TEditAction AAction) override;
  /// The root's edit state, asked again only after a change of the structure.
  TEditState GetEditState() override;

  // IOTADragStructureContext ---------------------------------------------------------
  TOTABool DragAllowed(const IPtr<IOTAStructureNode>&) override { return OTATrue; }
  IPtr<IOTADataObject> GetDataObject() override { return nullptr; }
  /// On entering, puts the view's selected sprigs into the data object; accepts a drop on
  /// a node (not between nodes) that takes every dragged sprig, none of which is it or
  /// above it.
  void DragOver(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject, TOTADragState AState,
                int AX, int AY, TOTADropMode AMode, int& AEffect, TOTABool& AAccept) override;
  /// Drops each dragged sprig on the node's sprig in order and selects their items.
  void DragDrop(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject, int AFormats, int AX,
                int AY, TOTADropMode AMode, int& AEffect) override;

  // IDesignNotification: only the selection matters here --------------------------------
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemsModified(const IPtr<IDesigner>&) override {}
  /// Carries the designer's selection to the view when this context is the one shown.
  void SelectionChanged(const IPtr<IDesigner>& ADesigner, const IPtr<IDesignerSelections>& ASelection) override;
  void DesignerOpened(const IPtr<IDesigner>&, bool) override {}
  void DesignerClosed(const IPtr<IDesigner>&, bool) override {}

  /// The tree of `ADesigner` changed: the view reads it again, deferred.
  void StructureChanged(const IPtr<IDesigner>& ADesigner) noexcept;
  /// Bound to the application's idle event: an empty view selection that lasted until
  /// now empties the designer's.
  void Idle() noexcept;

  void LockSelect() noexcept { ++FSelectLocks; }
  void UnlockSelect() noexcept { --FSelectLocks; }
  bool SelectLocked() const noexcept { return FSelectLocks > 0; }
  bool PendingClearSelection() const noexcept { return FPendingClearSelection; }

private:
  void DoNodeSelected();
  void DoSelectionChanged(const IPtr<IDesigner>& ADesigner, const IPtr<IDesignerSelections>& ASelection);
  void DoInvoke(int AIndex);
  void DoDragOver(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject, TOTADragState AState,
                  TOTADropMode AMode, int& AEffect, TOTABool& AAccept);
  void DoDragDrop(const IPtr<IOTAStructureNode>& ANode, const IPtr<IInterface>& ADataObject);
  void DoInitPopupMenu(const IPtr<IOTAStructureNode>& ANode, const IPtr<IOTAStructureNodeMenuItem>& AMenu);
  /// The sprig's own entries and its add types, at the top of the popup's items.
  void AddSprigEntries(TSprig* Sprig, const IPtr<IMenuItem>& Items);
  IPtr<IDesigner> RootDesigner() const;

  TRootSprig* FRootSprig;
  int FSelectLocks = 0;
  IPtr<IPopupMenu> FLastPopup;
  bool FEditStateDirty = true;
  TEditState FEditState;
  bool FPendingClearSelection = false;
};

/// The context of `ARootSprig`'s tree, made at the first request, registered as a
/// design notification and kept by the root; null for no root.
FK_API IPtr<IOTAStructureContext> StructureContextFor(TRootSprig* ARootSprig);
/// Routes the structure changes of the current root sprig list to the contexts; a
/// restarted tree needs it again.
FK_API void InstallStructureViewBridge();

} // namespace formkit
