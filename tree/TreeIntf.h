//===- tree/TreeIntf.h - Sprigs: the nodes of the structure tree ---------===//
//
// The structure tree shows one designed module as a tree of sprigs. A sprig
// wraps one object of the module (its item) or nothing (a grouping node), and
// knows where it belongs: it works out its own parent and children, its
// caption and image, and whether it may be moved, dragged or deleted. The root
// sprig (tree/RootSprig.h) owns a tree and keeps it in step with the designer;
// the registry (tree/SprigRegistry.h) says which sprig class shows what.
//
// Example:
//   TObjectGuard<TSprig> Node = NewSprig(TComponentSprig::StaticClass(), Button);
//   Root->Add(Node.Release());          // the parent owns it from now on
//   Root->Find(Button)->Caption();      // "Button1"
//
// Everything here runs on the host's user-interface thread.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "tree/StructureViewAPI.h"
#include "tree/SprigTreeView.h"

#include <functional>
#include <memory>
#include <vector>

namespace formkit {

class TSprig;
class TRootSprig;

/// The class reference of a sprig class (a `TSprig` descendant).
using TSprigClass = TClass;
/// The class reference of a root sprig class (a `TRootSprig` descendant).
using TRootSprigClass = TClass;
/// An action of `TSprig::ForEach`.
using TSprigAction = std::function<void(TSprig*)>;
/// Draws a sprig's glyph into a bitmap; the host sets it.
using TCopySprigGlyphFunc = std::function<bool(TSprig* Sprig, TObject* Bitmap)>;

/// How the selected sprigs may be deleted.
FK_ENUM(TSprigDeleteStyle, std::uint8_t, dsNormal, dsIgnore, dsAbort, dsCustom)

//===----------------------------------------------------------------------===//
// Unit globals
//===----------------------------------------------------------------------===//

/// Adds class names to captions. Default false.
FK_API extern bool GShowClassNameInTreeView;
/// Where the host put the tree's image strips in its own image list; -1 until it says.
FK_API extern int GImageOffset;
FK_API extern int GStateImageOffset;
FK_API extern int GToolButtonImageOffset;
/// The images of a control sprig, without and with its parent set.
FK_API extern const int CUIControlImageIndex[2];
/// The clipboard format of the drag payload. The design core's clipboard knows formats by
/// name, so the name is the format's identity.
inline constexpr const char* GSprigClipboardFormat = "Halvern.Sprig";
/// Set by the host; unset by default.
FK_API extern TCopySprigGlyphFunc CopySprigGlyphFunc;

/// The base image strip: an item-less sprig, an abstract collection, a sprig with an item,
/// a collection, a component. A ghosted sprig shows its image this many places on.
inline constexpr int SprigImageNone = 0;
inline constexpr int SprigImageAbstractCollection = 1;
inline constexpr int SprigImageItem = 2;
inline constexpr int SprigImageCollection = 3;
inline constexpr int SprigImageComponent = 4;
inline constexpr int SprigImageGhostOffset = 10;

//===----------------------------------------------------------------------===//
// Interfaces
//===----------------------------------------------------------------------===//

/// Leads from a selected node of the host's view back to its sprig.
struct FK_API ISprig : IInterface {
  FK_INTERFACE(ISprig, IInterface, "{156098B8-0BCD-4550-8174-37B3C38918F4}")
  /// The sprig; null once it has died.
  virtual TSprig* GetSprig() = 0;
};

/// A tree-owning editor that shows a root sprig in its own tree view.
struct FK_API ISprigDesigner : IInterface {
  FK_INTERFACE(ISprigDesigner, IInterface, "{6AC141E3-2FBE-425E-B299-AB29E7DF3FBB}")
  /// The tree view in use.
  virtual TCustomTreeView* GetTreeView() = 0;
  /// The editor's own operations, not called by this library.
  virtual void BeforeItemsModified() = 0;
  virtual void AfterItemsModified() = 0;
  virtual void ItemsChanged() = 0;
  /// The root to show, or null on disconnection.
  virtual void SetRootSprig(TRootSprig* ARootSprig) = 0;
};

/// A collection shown as sprigs by an outside editor; not called by this library.
struct FK_API ISprigCollection : IInterface {
  FK_INTERFACE(ISprigCollection, IInterface, "{0B6ABAEE-E1A4-4DAC-8E20-C6B741A5082D}")
  virtual bool RootSprigAssigned() = 0;
  virtual TRootSprig* RetrieveRootSprig() = 0;
  virtual IPtr<IDesigner> GetSprigDesigner() = 0;
  virtual void SetSprigDesigner(const IPtr<IDesigner>& ADesigner) = 0;
};

//===----------------------------------------------------------------------===//
// TInformant
//===----------------------------------------------------------------------===//

/// Objects linked both ways that tell each other of changes; a link to an object that is
/// destroyed breaks by itself. Does not own what it links to.
class FK_API TInformant : public TObject {
  FK_CLASS(TInformant, TObject)
  TInformant() = default;

  /// Links both ways.
  void Notify(TInformant* AInformant);
  /// Unlinks both ways.
  void Unnotify(TInformant* AInformant);
  void DisableNotify() noexcept { ++FDisableNotify; }
  /// Runs an owed notification once the counter is back at 0.
  void EnableNotify();
  /// Tells every linked informant, last first; only owed while notifications are off.
  void Notification();
  /// Told by a linked informant; breaks the link when `ASender` is being destroyed.
  virtual void Changed(TInformant* ASender);
  bool IsDestroying() const noexcept { return FDestroying; }
  /// The informants linked to this one, in the order of linking.
  const std::vector<TInformant*>& Linked() const noexcept;
  void BeforeDestruction() override;

protected:
  /// Marks the informant as going and tells the linked ones; once. Teardowns of derived
  /// classes call it first, so that the links break before anything else goes.
  void BeginDestruction();

private:
  std::unique_ptr<std::vector<TInformant*>> FNotifyList;
  int FDisableNotify = 0;
  bool FNotifyNeeded = false;
  bool FDestroying = false;
};

//===----------------------------------------------------------------------===//
// TSprig
//===----------------------------------------------------------------------===//

/// A node of the structure tree. Owns its children; does not own its item.
class FK_API TSprig : public TInformant {
  FK_CLASS(TSprig, TInformant)
  TSprig() = default;

  /// The constructor logic, made from the class reference by `NewSprig`; overrides call
  /// the inherited one first.
  virtual void Create(TPersistent* AItem);

  // Children ---------------------------------------------------------------
  /// Makes `AItem` the last child (or its place by index) and returns it. Changes nothing
  /// when it is already a child, or is this sprig or one above it. This sprig must be in
  /// a tree; the parent owns `AItem` from now on.
  TSprig* Add(TSprig* AItem);
  /// The number of children; 0 without a list.
  int Count() const noexcept { return FList ? static_cast<int>(FList->size()) : 0; }
  /// The child at `Index`; null without children.
  TSprig* Items(int Index) const;
  /// The position in the parent, -1 without one.
  int Index() const;
  /// Moves this sprig within its parent (`SetIndexOf` of the parent).
  void SetIndex(int Value);
  /// The position of a child, -1 when it is none.
  int IndexOf(const TSprig* AItem) const;
  /// Moves a child to `AIndex`, clipped to the list.
  void SetIndexOf(TSprig* AItem, int AIndex);
  /// True when this sprig is `AItem` or above it.
  bool Parents(const TSprig* AItem) const;
  /// The parent; null for a root or a sprig not yet added.
  TSprig* Parent() const noexcept { return FParent; }
  /// The root of the tree the sprig is in; null until it is added under one.
  TRootSprig* Root() const noexcept { return FRoot; }
  /// The object shown, not owned; null for grouping nodes and invalid sprigs.
  TPersistent* Item() const noexcept { return FItem; }
  /// True once the item is gone and the sprig waits to be freed.
  bool Invalid() const noexcept { return FInvalid; }
  /// The stored expansion state.
  bool Expanded() const noexcept { return FExpanded; }

  // Searches ---------------------------------------------------------------
  /// The sprig of `AItem` here or below (`FindItem`); the root answers from its index.
  TSprig* Find(TPersistent* AItem, bool ARecurse = true) { return FindItem(AItem, ARecurse); }
  /// The sprig named `AName` without regard to case (`FindItemByName`), optionally of an
  /// item of `AClass`.
  TSprig* Find(const String& AName, bool ARecurse = true) { return FindItemByName(AName, nullptr, ARecurse); }
  TSprig* Find(const String& AName, TClass AClass, bool ARecurse = true) {
    return FindItemByName(AName, AClass, ARecurse);
  }
  /// The sprig whose `Path` is `APath` without regard to case (`FindItemByPath`).
  TSprig* FindPath(const String& APath, bool ARecurse = true) { return FindItemByPath(APath, ARecurse); }
  /// The sprig that should be this one's parent for the parent object `AItem`: the current
  /// parent, a sprig found through the owner or the root, or one of the object's owners
  /// that adopts orphans; else the root. Null only outside a tree.
  TSprig* SeekParent(TPersistent* AItem, bool ARecurse);
  /// The same by a parent's name; the root when none is found.
  TSprig* SeekParent(const String& AName, bool ARecurse);
  /// The same by name and class; searches only through an owner, else gives the root.
  TSprig* SeekParent(const String& AName, TClass AClass, bool ARecurse);
  /// Calls `ABefore` on this sprig, the children from the last to the first, then `AAfter`;
  /// an invalid sprig is skipped with its subtree. A child list may change meanwhile.
  void ForEach(const TSprigAction& ABefore, const TSprigAction& AAfter);

  // Text -------------------------------------------------------------------
  /// The names from the root down, "Parent\Child".
  String Path();
  /// `AName`, with "<?>" for an empty name and " {Receiver}" when a receiver is given, and
  /// " (ClassName)" while class names are shown (the item's class when none is given).
  String CaptionFor(const String& AName, const String& AReceiver = "", const String& AClassName = "");

  // Life -------------------------------------------------------------------
  /// Once: the item is gone, the sprig waits to be freed. Its children follow.
  void Invalidate();
  /// Forgets the widget nodes of this sprig and its subtree and deletes them.
  void ClearTreeNode() { ClearTreeNode(true, true); }
  /// Forgets the widget node (and, with `ARecurse`, those of the subtree, deleted), and
  /// deletes it when `AFreeNode` is true and its view is not going.
  void ClearTreeNode(bool ARecurse, bool AFreeNode);
  /// Frees invalid children and transient children without children, from the last.
  void ClearUnneededSprigs();
  /// Calls `Reparent` on each child, from the last.
  void ReparentChildren();
  /// Stores the expansion state; true expands the parents too.
  void SetExpanded(bool AValue);
  /// The class this sprig drags as; its own class.
  TClass DragClass() const { return ClassType(); }
  /// The class's icon in the host's image list; 0 for none.
  int GetIconIndex() const noexcept { return FIconIndex; }
  /// The widget node that shows this sprig, if a tree view is attached.
  TTreeNode* TreeNode() const noexcept { return FTreeNode; }
  /// Attaches the widget node that shows this sprig (the node points back through `Data`).
  void SetTreeNode(TTreeNode* ANode) noexcept;
  /// The host view's node of this sprig, when the view made one.
  const IPtr<IOTAStructureNode>& StructureNode() const noexcept { return FStructureNode; }
  /// Set by the bridge to the host's view when it makes the sprig's node.
  void SetStructureNode(const IPtr<IOTAStructureNode>& ANode) { FStructureNode = ANode; }
  /// The text last pushed to the tree node.
  const String& NodeCaption() const noexcept { return FCaption; }

  // Virtual operations -------------------------------------------------------
  /// The item's name path; empty without an item.
  virtual String UniqueName();
  /// Makes `AItems` the designer's selection (the root does it).
  virtual void SelectItems(const std::vector<TPersistent*>& AItems, bool ARuntimeChange = true);
  /// Tells the designer the module changed (the root does it).
  virtual void RuntimeChange();
  virtual void DesigntimeChange();
  /// The search by identity: this sprig, then each child and, with `ARecurse`, its subtree.
  virtual TSprig* FindItem(TPersistent* AItem, bool ARecurse);
  /// The search by name, in the same order; an empty name finds nothing.
  virtual TSprig* FindItemByName(const String& AName, TClass AClass, bool ARecurse);
  /// The search by path, in the same order; an empty path finds nothing.
  virtual TSprig* FindItemByPath(const String& APath, bool ARecurse);
  /// The module's designer through the root; false without one.
  virtual bool GetDesigner(IPtr<IDesigner>& ADesigner);
  /// The class icon when there is one (relative to `GImageOffset`), else the image of the
  /// sprig's kind, 10 places on when ghosted.
  virtual int GetImageIndex();
  virtual void SetImageIndex(int AValue) { FImageIndex = AValue; }
  /// 1 while `AnyProblems`, else 0.
  virtual int GetStateIndex() { return AnyProblems() ? 1 : 0; }
  /// The update bracket of the root's view (see `TRootSprig`).
  virtual void BeginUpdate();
  virtual void EnsureUpdate();
  virtual void EndUpdate();
  /// The caption of the `AIndex`th thing that can be added here.
  virtual String GetAddType(int) { return ""; }
  /// A transient sprig lives only while it has children.
  virtual bool Transient() { return false; }
  /// True when the item should hang on a parent object (`ParentProperty`) and does not.
  virtual bool AnyProblems();
  /// Whether the designer hides the item; asked once, when a designer can be had.
  /// Persistents that are no components are hidden.
  virtual bool Hidden();
  virtual bool Ghosted() { return Hidden(); }
  /// The item, or the nearest parent's.
  virtual TPersistent* FocusItem();
  virtual TClass ItemClass() { return FItem ? FItem->ClassType() : nullptr; }
  /// The sprig a parentless sprig goes under; null: the root.
  virtual TSprig* Owner() { return nullptr; }
  /// Pushes the caption (clipped), image and state to the widget node, if any.
  virtual void VisualRefresh();
  virtual TTreeNode* TreeNodeFor(TCustomTreeView*) { return FTreeNode; }
  virtual String Name() { return UniqueName(); }
  /// `CaptionFor(Name)`, opened by "Index - " when `IncludeIndexInCaption`.
  virtual String Caption();
  virtual String Hint() { return ""; }
  virtual void PrepareMenu(const IPtr<IMenuItems>&) {}
  /// Whether the registered component menus apply: with an item.
  virtual bool ShowRegisteredMenus() { return FItem != nullptr; }
  /// Whether `AItem` may be dropped here (asks `AItem->DragOverTo`).
  virtual bool DragOver(TSprig* AItem) { return AItem && AItem->DragOverTo(this); }
  /// Whether this sprig may go under `AParent`: over the root, or a parent whose item is
  /// of the class the parent property takes.
  virtual bool DragOverTo(TSprig* AParent);
  /// Drops `AItem` here (asks `AItem->DragDropTo`).
  virtual bool DragDrop(TSprig* AItem) { return AItem && AItem->DragDropTo(this); }
  /// Sets the parent property to `AParent`'s item (nil over the root); raises what the
  /// property's writer raises.
  virtual bool DragDropTo(TSprig* AParent);
  /// Whether a new component of `AClass`, shown by sprigs of `ASprigClass`, may go here.
  virtual bool PaletteOver(TSprigClass ASprigClass, TClass AClass);
  /// The class operation behind `PaletteOver`: it uses no state of the instance.
  virtual bool PaletteOverTo(TSprig* AParent, TClass AClass);
  /// How the sprig takes part in deleting a selection.
  virtual TSprigDeleteStyle DeleteStyle() { return FItem ? dsNormal : dsAbort; }
  /// The deletion of a `dsCustom` sprig; true when something was deleted.
  virtual bool CustomDelete() { return false; }
  /// Whether the sprig may swap with its neighbour in an index-ordered parent; needs the
  /// host view's node and its parent there.
  virtual bool CanMove(bool AUp);
  /// Drops the sprig on its neighbour and selects its item on success.
  virtual bool Move(bool AUp);
  virtual bool CanAdd() { return AddTypeCount() > 0; }
  /// How many kinds of things can be added here, and adding one.
  virtual int AddTypeCount() { return 0; }
  virtual void AddType(int) {}
  /// Sorts the children by `ItemIndex` when `SortByIndex`; stable.
  virtual void SortItems();
  /// Whether the children stand in the order of their `ItemIndex`.
  virtual bool SortByIndex() { return false; }
  virtual bool IncludeIndexInCaption() { return false; }
  virtual int ItemIndex() { return 0; }
  /// Draws the glyph through `CopySprigGlyphFunc`; false without one.
  virtual bool CopyGlyph(TObject* ABitmap);
  virtual void Reparent() {}
  /// A new component of `AClass` in this sprig's component; null without a designer.
  virtual TComponent* Construct(TClass AClass);
  /// A class operation: the class-typed property of the item that names its parent
  /// object; empty for none.
  virtual String ParentProperty() { return ""; }
  /// Moves the sprig under the sprig of its parent object, or of its owner, or the root.
  virtual void FigureParent();
  /// Once per sprig: gives the item's published collections sprigs of their own.
  virtual void FigureChildren();
  /// Whether the sprig adopts descendants of its item whose own parents have no sprig.
  virtual bool ParentOrphanedSprigs() { return false; }

  void BeforeDestruction() override;

protected:
  /// The class-typed property `ParentProperty` names on `Class`, or null.
  PPropInfo ParentPropInfo(TClass Class);
  /// The neighbour of this sprig in its parent's list, before (`AUp`) or after; null.
  TSprig* Neighbour(bool AUp) const;

private:
  friend class TRootSprig;
  /// Takes `AItem` out of this sprig's list without freeing it.
  void Extract(TSprig* AItem);
  /// Gives each published collection of the item that has no sprig yet a sprig of its own.
  void FigureCollections();
  /// Looks the icon of the item's class up: the cache, else the host's palette.
  void FigureIcon();

  TRootSprig* FRoot = nullptr;
  TSprig* FParent = nullptr;
  std::unique_ptr<std::vector<TSprig*>> FList; // owned sprigs
  TPersistent* FItem = nullptr;
  TTreeNode* FTreeNode = nullptr;
  int FImageIndex = 0;
  int FIconIndex = 0;
  String FCaption;
  bool FExpanded = false;
  bool FInvalid = false;
  bool FCollectionsDone = false;
  bool FHidden = false;
  bool FHiddenTested = false;
  /// The root's validation pass that last figured this sprig.
  int FValidatedPass = 0;
  IPtr<IOTAStructureNode> FStructureNode;
};

/// The node class of a widget tree that shows sprigs: tells its sprig when it goes.
class FK_API TSprigTreeNode : public TTreeNode {
  FK_CLASS(TSprigTreeNode, TTreeNode)
  TSprigTreeNode() = default;
  void BeforeDestruction() override;
};

namespace detail {
/// `P` as a component, or null. Asks the class record: a tree reads this for every
/// sprig on every pass, and a `dynamic_cast` across libraries costs several times more.
inline TComponent* AsComponent(TPersistent* P) noexcept {
  return P && P->InheritsFrom(TComponent::StaticClass()) ? static_cast<TComponent*>(P) : nullptr;
}
} // namespace detail

/// A new sprig of `ASprigClass` on `AItem`, constructed through its virtual `Create`.
[[nodiscard]] FK_API TObjectGuard<TSprig> NewSprig(TSprigClass ASprigClass, TPersistent* AItem);

/// The clipping of a caption on its way to a tree node: 80 characters or more become the
/// first 76 and "... ".
FK_API String ClipSprigCaption(const String& Caption);

//===----------------------------------------------------------------------===//
// Simple sprigs
//===----------------------------------------------------------------------===//

/// A grouping node of its own.
class FK_API TAbstractSprig : public TSprig {
  FK_CLASS(TAbstractSprig, TSprig)
  TAbstractSprig() = default;
  bool Ghosted() override { return false; }
};

/// A grouping node that lives only while it has children.
class FK_API TTransientSprig : public TAbstractSprig {
  FK_CLASS(TTransientSprig, TAbstractSprig)
  TTransientSprig() = default;
  bool Transient() override { return true; }
};

/// A transient grouping node of collections.
class FK_API TTransientCollectionSprig : public TTransientSprig {
  FK_CLASS(TTransientCollectionSprig, TTransientSprig)
  TTransientCollectionSprig() = default;
  void Create(TPersistent* AItem) override;
};

/// A grouping node of collections.
class FK_API TAbstractCollectionSprig : public TAbstractSprig {
  FK_CLASS(TAbstractCollectionSprig, TAbstractSprig)
  TAbstractCollectionSprig() = default;
  void Create(TPersistent* AItem) override;
};

/// The base of sprigs that have an item.
class FK_API TPersistentSprig : public TSprig {
  FK_CLASS(TPersistentSprig, TSprig)
  TPersistentSprig() = default;
};

/// The sprig of a component; its owner sprig is where it goes without a parent object.
class FK_API TComponentSprig : public TPersistentSprig {
  FK_CLASS(TComponentSprig, TPersistentSprig)
  TComponentSprig() = default;
  void Create(TPersistent* AItem) override;
  /// `Create(AItem)`, then the owner sprig.
  void Create(TPersistent* AItem, TSprig* AOwner);
  String UniqueName() override;
  TSprig* Owner() override { return FOwner; }
  void SetOwner(TSprig* AOwner) noexcept { FOwner = AOwner; }

private:
  TSprig* FOwner = nullptr;
};

//===----------------------------------------------------------------------===//
// Collection sprigs
//===----------------------------------------------------------------------===//

/// A sprig that stands for one property value; cannot be deleted.
class FK_API TPropertySprig : public TPersistentSprig {
  FK_CLASS(TPropertySprig, TPersistentSprig)
  TPropertySprig() = default;
  TSprigDeleteStyle DeleteStyle() override { return dsAbort; }
  bool Ghosted() override { return false; }
};

/// The sprig of a published collection property; its items are its children, in the
/// collection's order. `SetOwner` and `SetPropName` come before it is added.
class FK_API TCollectionSprig : public TPropertySprig {
  FK_CLASS(TCollectionSprig, TPropertySprig)
  TCollectionSprig() = default;
  void Create(TPersistent* AItem) override;
  TSprigDeleteStyle DeleteStyle() override { return dsCustom; }
  /// Clears a collection that has items; an empty one is left alone (false).
  bool CustomDelete() override;
  String Caption() override { return CaptionFor(FPropName); }
  String Name() override;
  void FigureParent() override;
  void FigureChildren() override;
  bool SortByIndex() override { return true; }
  /// Drops the sprigs of items that left the collection, then sorts by index.
  void SortItems() override;
  int AddTypeCount() override { return 1; }
  String GetAddType(int AIndex) override;
  void AddType(int AIndex) override;
  TSprig* Owner() override { return FOwner; }
  void SetOwner(TSprig* AOwner) noexcept { FOwner = AOwner; }
  const String& PropName() const noexcept { return FPropName; }
  void SetPropName(const String& AName) { FPropName = AName; }

private:
  /// Invalidates the children whose items are no longer in the collection; compares
  /// addresses only, since such an item may be gone.
  void DropGoneItems();

  String FPropName;
  TSprig* FOwner = nullptr;
};

/// The sprig of one collection item, captioned with its index; dragged only among its
/// siblings.
class FK_API TCollectionItemSprig : public TPersistentSprig {
  FK_CLASS(TCollectionItemSprig, TPersistentSprig)
  TCollectionItemSprig() = default;
  void FigureParent() override;
  String Name() override;
  int ItemIndex() override;
  bool IncludeIndexInCaption() override { return true; }
  bool DragOverTo(TSprig* AParent) override;
  bool DragDropTo(TSprig* AParent) override;
  int AddTypeCount() override;
  String GetAddType(int AIndex) override;
  void AddType(int AIndex) override;
  TSprig* Owner() override { return FOwner; }
  void SetOwner(TSprig* AOwner) noexcept { FOwner = AOwner; }
  bool Ghosted() override { return false; }

private:
  TSprig* FOwner = nullptr;
};

/// The drag object of a widget tree: the sprigs dragged. Does not own them.
class FK_API TDragSprigs : public TObject {
  FK_CLASS(TDragSprigs, TObject)
  TDragSprigs() = default;
  void Add(TSprig* ASprig) { FSprigs.push_back(ASprig); }
  int Count() const noexcept { return static_cast<int>(FSprigs.size()); }
  TSprig* Sprigs(int Index) const { return FSprigs.at(static_cast<std::size_t>(Index)); }

private:
  std::vector<TSprig*> FSprigs;
};

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

/// Joins the structure tree to the start and stop of the design core: the registries,
/// the icon cache, the clipboard format and the default registrations. Idempotent.
FK_API void InitializeStructureTree();
/// How many classes the icon cache knows; for tests.
FK_API int SprigIconCacheSize() noexcept;

} // namespace formkit
