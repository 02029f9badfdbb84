//===- tree/RootSprig.h - The root of a structure tree and its upkeep ----===//
//
// `TRootSprig` tops the tree of one designed module: it owns the tree, keeps it
// in step with the designer through the design notifications, and carries the
// tree's selection to the designer. The tree is rebuilt lazily: a change marks
// the root, and the next refresh repopulates it, keeping the sprigs that still
// match. `TSprigIndex` finds a sprig by its item; `TRootSprigList` finds the
// root sprig of a designer.
//
// Example:
//   InitDesignNotification();                 // the tree follows every designer
//   TRootSprig* Root = nullptr;
//   if (RootSprigList()->FindRoot(Designer, Root)) Root->RefreshTreeView();
//   Root->Find(Button1)->Path();              // "Form1\Panel1\Button1"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tree/TreeIntf.h"

#include <array>
#include <unordered_map>
#include <unordered_set>

namespace formkit {

//===----------------------------------------------------------------------===//
// TSprigIndex
//===----------------------------------------------------------------------===//

/// The sprigs of a tree by item: 256 buckets chosen by the second-lowest byte of the
/// item's address. Does not own the sprigs.
class FK_API TSprigIndex : public TObject {
  FK_CLASS(TSprigIndex, TObject)
  TSprigIndex() = default;
  void Add(TSprig* ASprig);
  void Remove(TSprig* ASprig);
  /// The first sprig of `AItem`, or null. Cost: one bucket.
  TSprig* Find(const TPersistent* AItem) const;

private:
  /// Each sprig beside its item, so that a search reads no sprig it does not return.
  using TBucket = std::vector<std::pair<const TPersistent*, TSprig*>>;
  static std::size_t BucketOf(const TPersistent* AItem) noexcept;
  std::array<std::unique_ptr<TBucket>, 256> FList;
};

//===----------------------------------------------------------------------===//
// TRootSprig
//===----------------------------------------------------------------------===//

/// The top of the structure tree of one module; its item is the root component.
class FK_API TRootSprig : public TPersistentSprig {
  FK_CLASS(TRootSprig, TPersistentSprig)
  TRootSprig() = default;
  void Create(TPersistent* AItem) override;

  /// Whether components of `AClass` may stand in this tree.
  virtual bool AcceptsClass(TClass AClass);

  /// Tells the designer the module changed.
  void RuntimeChange() override;
  void DesigntimeChange() override {}
  /// Makes `AItems` the designer's selection, in order; marks the module changed first
  /// when `ARuntimeChange`.
  void SelectItems(const std::vector<TPersistent*>& AItems, bool ARuntimeChange = true) override;
  bool GetDesigner(IPtr<IDesigner>& ADesigner) override;
  /// The root's own item gives the root; a deep search goes through the index.
  TSprig* FindItem(TPersistent* AItem, bool ARecurse) override;
  /// The root, then the remembered hits, then the tree; a hit found in the tree is
  /// remembered.
  TSprig* FindItemByName(const String& AName, TClass AClass, bool ARecurse) override;
  TSprig* FindItemByPath(const String& APath, bool ARecurse) override;
  /// Opens a bracket that holds back the view's update.
  void BeginUpdate() override { ++FUpdateLocks; }
  /// Owes the view an update, inside a bracket only.
  void EnsureUpdate() override;
  /// Closes a bracket; the last close announces an owed update to the host's view when
  /// the view shows this tree (else it stays owed) and restores the view's selection.
  void EndUpdate() override;
  TSprigDeleteStyle DeleteStyle() override { return dsAbort; }
  void FigureParent() override {}
  bool PaletteOver(TSprigClass, TClass) override { return true; }
  /// These apply to the one sprig selected in the host's view (`SelectedSprig`).
  bool CanMove(bool AUp) override;
  bool Move(bool AUp) override;
  bool CanAdd() override;
  int AddTypeCount() override;
  void AddType(int AIndex) override;
  String GetAddType(int AIndex) override;

  /// Puts a sprig with an item into the index; `Add` calls it.
  void AddItem(TSprig* ASprig);
  /// Takes a sprig out of the index and the search caches; `Invalidate` calls it.
  void RemoveItem(TSprig* ASprig);
  /// Brings the tree in step with the module's components; true when sprigs were made.
  /// Sprigs for new components start under the root and move under their parents, pass
  /// after pass, until a pass moves none. Cost: linear in the components, per pass.
  bool Repopulate();
  /// Repopulates when needed and sorts every child list, in one bracket.
  void RefreshTreeView();
  /// One step of a pass: the sprig figures its parent, then its children.
  void ValidateParent(TSprig* ASprig);
  void PostRefreshTreeView(TSprig* ASprig) { ASprig->SortItems(); }
  /// Stores whether the sprig's node is expanded and visible, and drops the node.
  void DepopulateTreeView(TSprig* ASprig);
  /// The editor's tree view; null without an editor.
  TCustomTreeView* TreeView();
  /// Hands the tree to another editor: the old one's nodes go and it is told last; the
  /// new one gets a refreshed tree.
  void SetSprigDesigner(const IPtr<ISprigDesigner>& ASprigDesigner);
  const IPtr<ISprigDesigner>& SprigDesigner() const noexcept { return FSprigDesigner; }
  /// The designer the tree belongs to; `TRootSprigList` sets it.
  void SetDesigner(const IPtr<IDesigner>& ADesigner) { FDesigner = ADesigner; }
  /// The context the host's view shows for this tree; set by the view bridge.
  const IPtr<IOTAStructureContext>& StructureContext() const noexcept { return FStructureContext; }
  void SetStructureContext(const IPtr<IOTAStructureContext>& AContext) { FStructureContext = AContext; }

  // Designer notifications ---------------------------------------------------
  /// Invalidates the sprig of `AItem` (never the root) and marks the tree; no rebuild.
  void ItemDeleted(TPersistent* AItem);
  /// Marks the tree for repopulation.
  void ItemInserted() { FRepopulateNeeded = true; }
  /// Marks the tree when asked, and re-sorts the children by index.
  void ItemsModified(bool ADoRepopulate);

  // The host view's selection ------------------------------------------------
  /// The delete style of the selected sprigs and whether all of them are visible.
  void SelectionSurvey(TSprigDeleteStyle& ADeleteStyle, bool& AAllVisible);
  /// Cut, copy and delete by the survey (custom sprigs delete themselves); the other
  /// actions go to the designer's edit handler. False without one.
  bool EditAction(TEditAction AAction);
  /// The handler's state, without what the selection forbids.
  TEditState GetEditState();
  /// The one sprig selected in the host's view, when it is not the root's own node.
  bool SelectedSprig(TSprig*& ASprig);

  bool RepopulateNeeded() const noexcept { return FRepopulateNeeded; }
  bool NeedUpdate() const noexcept { return FNeedUpdate; }
  int UpdateLocks() const noexcept { return FUpdateLocks; }
  int NamedCacheSize() const noexcept { return static_cast<int>(FNamedItems.size()); }
  int PathedCacheSize() const noexcept { return static_cast<int>(FPathedItems.size()); }

  void BeforeDestruction() override;

private:
  friend class TSprig;
  /// Calls `Fn` on each sprig selected in the host's view.
  void ForEachSelectedSprig(const std::function<void(TSprig*)>& Fn);
  bool CustomDeleteSelection();
  /// Walks the tree, each sprig before its children and the children from the last:
  /// frees invalid sprigs and collects the items of the others in `Shown`.
  void SweepTree(TSprig* ASprig, std::unordered_set<TPersistent*>& Shown);

  std::unique_ptr<TSprigIndex> FIndex;
  std::vector<TSprig*> FNamedItems;
  std::vector<TSprig*> FPathedItems;
  bool FRepopulating = false;
  bool FParentChanges = false;
  IPtr<ISprigDesigner> FSprigDesigner;
  IPtr<IDesigner> FDesigner;
  bool FRepopulateNeeded = true;
  bool FNeedUpdate = false;
  int FUpdateLocks = 0;
  IPtr<IOTAStructureContext> FStructureContext;
};

//===----------------------------------------------------------------------===//
// TRootSprigList
//===----------------------------------------------------------------------===//

/// The root sprig of each open designer, by its root component. Frees its sprigs when
/// their designers close.
class FK_API TRootSprigList : public TObject {
  FK_CLASS(TRootSprigList, TObject)
  TRootSprigList() = default;

  void DesignerOpened(const IPtr<IDesigner>& ADesigner, bool AResurrecting);
  void DesignerClosed(const IPtr<IDesigner>& ADesigner, bool AGoingDormant);
  bool FindRoot(const IPtr<IDesigner>& ADesigner, TRootSprig*& ARootSprig);
  void ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem);
  void ItemInserted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem);
  void ItemsModified(const IPtr<IDesigner>& ADesigner);
  int Count() const noexcept { return static_cast<int>(FList.size()); }
  void BeforeDestruction() override;

  /// Told after each change notification that reached a root outside an update bracket,
  /// with that root and its designer; the host view's bridge hangs here.
  std::function<void(TRootSprig*, const IPtr<IDesigner>&)> OnStructureChanged;

private:
  /// Tells the view bridge, when the root has a context and no update is open.
  void StructureChanged(TRootSprig* ARoot, const IPtr<IDesigner>& ADesigner);
  std::unordered_map<TComponent*, TRootSprig*> FList; // owned sprigs
};

/// The one list, made at first use and freed when the tree stops.
FK_API TRootSprigList* RootSprigList();
/// Registers the tree's listener of design notifications, once; a host or framework
/// package calls it.
FK_API void InitDesignNotification();
/// Unregisters and drops the listener.
FK_API void DoneDesignNotification();

} // namespace formkit
