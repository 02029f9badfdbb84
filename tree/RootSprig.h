//===- tree/RootSprig.h - The root of a structure tree and its upkeep ----===//
//
// `TRootSprig` tops the tree of one designed module: it owns the tree, keeps it
// in step with the designer through the design notifications, and carries the
// tree's selection to the designer. The tree is brought up to date lazily: a
// change notification only notes what it concerns (an item inserted, a sprig
// gone, the sprigs of the selection and of the collections after a change) and
// the next read repopulates just those, in time independent of the module's
// size; the first read, and a refresh after a change nobody described, go over
// the whole module. `TSprigIndex` finds a sprig by its item; `TRootSprigList`
// finds the root sprig of a designer.
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

#include <unordered_map>
#include <unordered_set>

namespace formkit {

//===----------------------------------------------------------------------===//
// TSprigIndex
//===----------------------------------------------------------------------===//

/// The sprigs of a tree by item, hashed on the item's address: a search costs the same
/// in a module of ten components as in one of a hundred thousand. Does not own the
/// sprigs; an item may have more than one, and the first added answers.
class FK_API TSprigIndex : public TObject {
  FK_CLASS(TSprigIndex, TObject)
  TSprigIndex() = default;
  void Add(TSprig* ASprig);
  void Remove(TSprig* ASprig);
  /// The first sprig of `AItem`, or null.
  TSprig* Find(const TPersistent* AItem) const;
  /// Makes room for `ACount` items at once.
  void Reserve(std::size_t ACount) { FList.reserve(ACount); }

private:
  /// The sprigs of one item: the first, and the later ones in the rare case of several.
  struct TEntry {
    TSprig* First = nullptr;
    std::unique_ptr<std::vector<TSprig*>> More;
  };
  std::unordered_map<const TPersistent*, TEntry> FList;
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
  /// after pass, until a pass moves none. The whole module is read the first time and
  /// after `ItemInserted()`; otherwise only what the notifications noted since the last
  /// read: the inserted items, the sprigs gone, the sprigs to figure again. Cost: linear
  /// in what is read, per pass.
  bool Repopulate();
  /// Repopulates when needed and sorts every child list, in one bracket; after a change
  /// of the module that no notification described, the whole module is read again.
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
  /// The sprig is freed at the next repopulation.
  void ItemDeleted(TPersistent* AItem);
  /// Notes `AItem` for the next repopulation, which makes its sprig.
  void ItemInserted(TPersistent* AItem);
  /// Marks the whole tree for repopulation.
  void ItemInserted();
  /// Re-sorts the children of the sprigs that sort by index. When asked, marks the tree:
  /// the next repopulation figures again the sprigs of the designer's selection and of the
  /// collections, and the next refresh reads the whole module. Cost: the selection and
  /// the collections' items, whatever the module's size.
  void ItemsModified(bool ADoRepopulate);
  /// Notes `ASprig` to figure its parent and children again at the next repopulation.
  void FigureAgain(TSprig* ASprig);

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
  /// Walks the tree, each sprig before its children and the children from the last,
  /// and frees the invalid sprigs.
  void SweepTree(TSprig* ASprig);
  /// The whole module: every component without a sprig gets one, every sprig is figured.
  bool RepopulateAll();
  /// Only what the notifications noted since the last read.
  bool RepopulateNoted();
  /// The answers of the registry during one read, by component class.
  using TClassMemo = std::vector<std::pair<TClass, TSprigClass>>;
  /// A sprig for `AComponent`, which has none, added under the root; null when no sprig
  /// class takes it.
  TSprig* NewComponentSprig(TComponent* AComponent, TClassMemo& Memo);
  /// Validation passes until one moves none: over the new sprigs with their subtrees,
  /// from the last, and over the sprigs noted to figure again (with a collection's items).
  void ValidateNoted(const std::vector<TSprig*>& AFresh, const std::vector<TSprig*>& AChanged);
  /// Validation passes over the whole tree until one moves none.
  void ValidateAll();
  /// One pass over a subtree, each sprig before its children and the children from the
  /// last; the subtree of a sprig that moves is left to its new parent's turn.
  void ValidateWalk(TSprig* ASprig);
  /// An invalid sprig (the top of an invalid subtree) waits to be freed.
  void NoteInvalid(TSprig* ASprig);
  /// A sprig is being destroyed: no list of pending work keeps it.
  void SprigGone(TSprig* ASprig) noexcept;
  /// Frees the invalid sprigs noted, and transient parents left without children.
  void FreeInvalidSprigs();
  /// Notes that `ASprig` waits for a sprig of its parent component, which has none yet.
  void NoteWaiting(TSprig* ASprig);
  /// Forgets every piece of pending work.
  void ClearNotes() noexcept;

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

  // Pending work of the next repopulation ------------------------------------------
  /// The whole module must be read.
  bool FRepopulateAll = true;
  /// The module changed in a way nobody described: the next refresh reads all of it.
  bool FUnverified = false;
  /// Items inserted, in order, and which of them are still there.
  std::vector<TPersistent*> FInserted;
  std::unordered_set<const TPersistent*> FInsertedLive;
  /// Sprigs to figure again.
  std::vector<TSprig*> FChanged;
  /// Invalid sprigs to free.
  std::unordered_set<TSprig*> FInvalidSprigs;
  /// Sprigs whose children stand by index: the collections.
  std::unordered_set<TSprig*> FSortedSprigs;
  /// Items of sprigs left elsewhere while their parent component had no sprig, by that
  /// parent.
  std::unordered_map<const TPersistent*, std::vector<const TPersistent*>> FWaiting;
  /// While the root's own children are validated: the position of the child being
  /// validated, whose extraction leaves a hole in the list until the pass ends.
  int FVisiting = -1;
  /// The valid sprigs attached to the tree, the root left out.
  std::size_t FAttached = 0;
  /// The current validation pass, the sprigs it figured and the sprigs it attached.
  int FPass = 0;
  std::size_t FPassFigured = 0;
  std::size_t FPassAttached = 0;
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
