//===- surface/Designer.h - Items, selections and the surface contract ---===//
//
// What a design surface and the gesture engine say to each other: the
// enumerations of the surface, the item family (`IItem` and its optional
// abilities), the surface-level selection list, the surface (`IDesignSurface`),
// its listener and the engine as a root sees it (`ISurfaceDesigner`). The base
// item `TPersistentItem` and the selection list `TSimpleSelections` live here
// too; the engine itself is `TDesigner` in surface/GestureEngine.h.
//
// Items are made on request and compared by what they stand for:
//   IPtr<ISelections> Sel = NewAs<ISelections, TSimpleSelections>();
//   Sel->Add(Surface->ItemFromComponent(Button));
//   Sel->Selected(Surface->ItemFromComponent(Button));   // true: another object, same item
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

#include <unordered_map>
#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// Enumerations and sets
//===----------------------------------------------------------------------===//

/// Front or back of the sibling order.
FK_ENUM(TZOrder, std::uint8_t, zoFront, zoBack)

/// The kind of a guide. The surface's guide type has the literals of the design
/// contract's `TDesignerGuideType` in the same order and converts by position; one
/// namespace cannot hold two unscoped enumerations with the same literals, so the
/// surface's type is an alias of the contract's.
using TGuideType = TDesignerGuideType;
/// A set of guide kinds in 16 bits; bit n stands for kind n.
using TGuideTypes = TSet<TGuideType, std::uint16_t>;
static_assert(sizeof(TGuideTypes) == 2);

/// Every guide kind that is a horizontal line at a Y position (0x1AAA).
inline constexpr TGuideTypes HorzGuideTypes{gtAlignTop,  gtAlignBottom,  gtMarginTop, gtMarginBottom,
                                           gtPaddingTop, gtPaddingBottom, gtBaseline};
/// Every guide kind that is a vertical line at an X position (0x0555).
inline constexpr TGuideTypes VertGuideTypes{gtAlignLeft,  gtAlignRight,   gtMarginLeft,
                                           gtMarginRight, gtPaddingLeft, gtPaddingRight};
static_assert(HorzGuideTypes.Mask() == 0x1AAA && VertGuideTypes.Mask() == 0x0555);

/// True for a guide kind on the Y axis (a horizontal line).
constexpr bool IsHorzGuide(TGuideType T) noexcept { return HorzGuideTypes.Contains(T); }

/// What a key event of a surface means to the engine.
FK_ENUM(TDesignKeyCode, std::uint8_t, dkNone, dkDelete, dkLeft, dkUp, dkRight, dkDown, dkTab,
        dkEnter, dkEscape, dkChar)

/// One edge of an item that a drag moves.
FK_ENUM(TMoveAffect, std::uint8_t, gaLeft, gaTop, gaRight, gaBottom)
/// The edges a drag moves, in one byte: left 1, top 2, right 4, bottom 8.
using TMoveAffects = TSet<TMoveAffect, std::uint8_t>;
static_assert(sizeof(TMoveAffects) == 1);
/// All four edges: a move rather than a resize.
inline constexpr TMoveAffects AllMoveAffects{gaLeft, gaTop, gaRight, gaBottom};

/// How a drag box is drawn: the rubber band, or the outline of an item.
FK_ENUM(TDesignBoxStyle, std::uint8_t, dbsSelection, dbsItem)

/// The gesture that runs, and so the state of the gesture engine.
FK_ENUM(TDragAction, std::uint8_t, daNone, daCreate, daSelect, daMove, daSize)


//===----------------------------------------------------------------------===//
// Items
//===----------------------------------------------------------------------===//

struct IItem;
struct IItemGuidelines;
struct IDragImage;
struct ISelections;
struct IDragBoxes;
struct IGrabHandles;
struct IGuidelinePainter;
struct IDesignSurfaceListener;

/// One object on a surface, in surface terms. Items are counted and short-lived: a
/// surface may make a new one whenever it is asked, so compare them with `SameItem`.
/// Bounds are in the parent's local coordinates; right and bottom are exclusive.
struct FK_API IItem : IInterface {
  FK_INTERFACE(IItem, IInterface, "{C41303AD-CAE3-11D3-AB47-00C04FB17A72}")
  /// Is `Item` inside this item.
  virtual bool Contains(const IPtr<IItem>& Item) = 0;
  /// Destroys what the item stands for.
  virtual void Delete() = 0;
  /// Global coordinates to this item's interior.
  virtual TPoint GlobalToLocal(const TPoint& Point) = 0;
  /// This item's interior to global coordinates.
  virtual TPoint LocalToGlobal(const TPoint& Point) = 0;
  /// True when `Item` stands for the same object.
  virtual bool Equals(const IPtr<IItem>& Item) = 0;
  virtual TRect GetBoundsRect() = 0;
  /// The bounds with everything that belongs to the item.
  virtual TRect GetExtendedRect() = 0;
  /// The interior, with origin (0, 0).
  virtual TRect GetClientRect() = 0;
  /// The enclosing item; null at the top.
  virtual IPtr<IItem> GetParent() = 0;
  virtual bool IsContainer() = 0;
  /// A press on it may start a rubber band among its children.
  virtual bool HasSelectableChildren() = 0;
  virtual void SetBoundsRect(const TRect& Rect) = 0;
  virtual bool Selectable() = 0;
  /// Raises when the item must not be deleted.
  virtual void ValidateDeletable() = 0;
  /// The default action of a double click.
  virtual void Edit() = 0;
};

/// An item that may keep out of a rubber-band selection. Items without it take part.
struct FK_API IComponentItem : IItem {
  FK_INTERFACE(IComponentItem, IItem, "{EBBB60E7-45FF-4461-BF1A-9D24AA0ABD6D}")
  virtual bool DragSelectable() = 0;
};

/// An item that offers guides and a drag image.
struct FK_API IItemEx : IItem {
  FK_INTERFACE(IItemEx, IItem, "{1325EA5F-56A8-419A-9A0E-EA314C61BD55}")
  /// An image to drag instead of an outline; null for an outline.
  virtual IPtr<IDragImage> GetDragImage() = 0;
  /// The guides the item offers; offsets are in the container item's coordinates.
  virtual IPtr<IItemGuidelines> GetItemGuidelines() = 0;
  /// The bounds with the item's margins added, in the parent's coordinates.
  virtual TRect GetPaddedBoundsRect() = 0;
  /// Does the item take part in guide snapping at all.
  virtual bool HasGuidelines() = 0;
};

/// Marks an item that the drag boxes take as a whole rather than as a rectangle. Its
/// own operations belong to the framework packages; this library only asks for it.
struct FK_API IItem2D : IItemEx {
  FK_INTERFACE(IItem2D, IItemEx, "{FB9FE8E7-0576-47A5-ADD4-B3F9981A1988}")
};

/// The way back from an item to its object.
struct FK_API IPersistentItem : IInterface {
  FK_INTERFACE(IPersistentItem, IInterface, "{C41303B0-CAE3-11D3-AB47-00C04FB17A72}")
  /// The object; not owned by the item.
  virtual TPersistent* GetItem() = 0;
  virtual String GetNamePath() = 0;
};

/// The guides of one item: a kind and a position each.
struct FK_API IItemGuidelines : IInterface {
  FK_INTERFACE(IItemGuidelines, IInterface, "{FB1DDCF5-5EE1-4212-BA03-435B21BBEF50}")
  virtual int GetCount() = 0;
  virtual TGuideType GetDesignerGuideType(int Index) = 0;
  /// The guide's position on its axis, in the container item's coordinates.
  virtual int GetDesignerGuideOffset(int Index) = 0;
};

/// The drag-time view of an item in surface coordinates, following a travelling offset
/// while a move runs (see `TItemWrapper`).
struct FK_API IItemWrapper : IInterface {
  FK_INTERFACE(IItemWrapper, IInterface, "{9176628C-79F0-47AD-865D-6EB4F70D9D6A}")
  virtual int GetLeft() = 0;
  virtual int GetTop() = 0;
  virtual int GetRight() = 0;
  virtual int GetBottom() = 0;
  virtual TPoint GetOffset() = 0;
  virtual int GetPaddedLeft() = 0;
  virtual int GetPaddedTop() = 0;
  virtual int GetPaddedRight() = 0;
  virtual int GetPaddedBottom() = 0;
  virtual IPtr<IItemEx> GetItem() = 0;
  virtual TRect GetBoundsRect() = 0;
  virtual TRect GetPaddedBoundsRect() = 0;
  virtual TRect GetClientRect() = 0;
  virtual void SetOffset(const TPoint& Offset) = 0;
  virtual void SetBoundsRect(const TRect& Rect) = 0;
};

/// Shows guide lines on a surface. Each line is a rectangle of width or height 0.
struct FK_API IGuidelinePainter : IInterface {
  FK_INTERFACE(IGuidelinePainter, IInterface, "{9266DB44-D85F-4A71-8E31-215CA9E88BFB}")
  virtual void AddGuide(const TRect& Rect, TGuideType GuideType) = 0;
  virtual void BeginPaint() = 0;
  virtual void ClearGuides() = 0;
  virtual void EndPaint() = 0;
};

/// An image dragged in place of an outline; drawn by the concrete drag boxes.
struct FK_API IDragImage : IInterface {
  FK_INTERFACE(IDragImage, IInterface, "{6986FA99-A57D-4ABF-AD17-9BB36010E898}")
  virtual void DrawImage() = 0;
};

/// The handles drawn around a single selected item.
struct FK_API IGrabHandles : IInterface {
  FK_INTERFACE(IGrabHandles, IInterface, "{C41303A9-CAE3-11D3-AB47-00C04FB17A72}")
  /// The item the handles are on; null when none.
  virtual IPtr<IItem> GetAttachedItem() = 0;
  /// Puts the handles on `Item`, or with null takes them away.
  virtual void AttachHandles(const IPtr<IItem>& Item) = 0;
  /// Active handles may be dragged; inactive ones (another module is active, or the
  /// controls are locked) are only shown.
  virtual void SetHandlesActive(bool Value) = 0;
  /// The edges that the handle under a surface point moves; empty off the handles.
  /// The surface uses it to fill the `Affects` of a press.
  virtual TMoveAffects HandleAtPoint(int X, int Y) = 0;
  virtual void RefreshHandles() = 0;
};

/// The palette as the engine sees it.
struct FK_API ITools : IInterface {
  FK_INTERFACE(ITools, IInterface, "{C41303AF-CAE3-11D3-AB47-00C04FB17A72}")
  /// Is a tool armed, so that the next press creates a component.
  virtual bool ToolSelected() = 0;
};

/// Told after each change (or batch of changes) of an `ISelections`.
struct FK_API ISelectionsListener : IInterface {
  FK_INTERFACE(ISelectionsListener, IInterface, "{3D642F40-D567-11D3-BA96-0080C78ADCDB}")
  virtual void SelectionChanged(const IPtr<ISelections>& Selections) = 0;
};

/// The selected items of a surface. Index 0 is the anchor, the item that alignment and
/// spacing refer to. Items are found by `SameItem`, not by reference; lookups are linear.
struct FK_API ISelections : IInterface {
  FK_INTERFACE(ISelections, IInterface, "{C41303AC-CAE3-11D3-AB47-00C04FB17A72}")
  virtual int GetCount() = 0;
  /// The item at `Index`: null while the list is empty, else `EListError` out of range.
  virtual IPtr<IItem> GetItems(int Index) = 0;
  /// The nesting depth of `BeginSelections`.
  virtual int GetSelectionLevel() = 0;
  /// Appends unless present.
  virtual void Add(const IPtr<IItem>& Item) = 0;
  virtual void AddListener(const IPtr<ISelectionsListener>& Listener) = 0;
  /// Opens a batch: listeners hear once, at the outer `EndSelections`, if anything changed.
  virtual void BeginSelections() = 0;
  virtual void Clear() = 0;
  /// Closes a batch; raises `EInvalidOperation` when none is open.
  virtual void EndSelections() = 0;
  /// Removes the item equal to `Item`, if any.
  virtual void Remove(const IPtr<IItem>& Item) = 0;
  /// Removes the item at `Index`: nothing while the list is empty, else `EListError`
  /// out of range.
  virtual void Remove(int Index) = 0;
  virtual void RemoveListener(const IPtr<ISelectionsListener>& Listener) = 0;
  virtual bool Selected(const IPtr<IItem>& Item) = 0;
  /// Adds if absent, else removes.
  virtual void Toggle(const IPtr<IItem>& Item) = 0;
};

//===----------------------------------------------------------------------===//
// Surface and engine
//===----------------------------------------------------------------------===//

/// What the gesture engine requires of a surface. Surface coordinates are those of the
/// mouse events; global coordinates are shared by surface and items.
struct FK_API IDesignSurface : IInterface {
  FK_INTERFACE(IDesignSurface, IInterface, "{37C644AA-6B33-4D7E-B18A-53D57E48010F}")
  /// A surface has one listener; a second call replaces the first.
  virtual void AddListener(const IPtr<IDesignSurfaceListener>& Listener) = 0;
  /// Opens a drag in `Parent`; the result draws the feedback and lives for the drag.
  virtual IPtr<IDragBoxes> BeginDrag(const IPtr<IItem>& Parent, const TPoint& Point) = 0;
  /// Releases the grab handles.
  virtual void Close() = 0;
  /// Creates the armed tool's component in `Parent` and returns its item.
  virtual IPtr<IItem> CreateItem(const IPtr<IItem>& Parent, const TRect& Rect, bool Scaled) = 0;
  /// The cursor position in surface coordinates.
  virtual TPoint GetCursorPoint() = 0;
  virtual void DeleteSelection() = 0;
  virtual TPoint DesignToGlobal(const TPoint& Point) = 0;
  virtual void DestroyItem(const IPtr<IItem>& Item) = 0;
  /// The neighbour of `Item` in tab order; the surface answers for null too.
  virtual IPtr<IItem> FindNextItem(const IPtr<IItem>& Item, bool Forward) = 0;
  /// Takes the keyboard; the first thing on every press.
  virtual void FocusSurface() = 0;
  virtual IPtr<IGrabHandles> GetGrabHandles() = 0;
  /// Null where the surface shows no guide lines.
  virtual IPtr<IGuidelinePainter> GetGuidelinePainter() = 0;
  /// The item of the root's selectable component at `Index`.
  virtual IPtr<IItem> GetItems(int Index) = 0;
  virtual int GetItemsCount() = 0;
  /// The point through which the grid passes.
  virtual TPoint GetOrigin() = 0;
  /// The item of the designed root.
  virtual IPtr<IItem> GetRoot() = 0;
  /// The outermost item in which children are placed.
  virtual IPtr<IItem> GetContainerItem() = 0;
  virtual TPoint GlobalToDesign(const TPoint& Point) = 0;
  /// The surface forbids grid snapping.
  virtual bool GridSnapDisabled() = 0;
  virtual IPtr<IItem> ItemAtPoint(int X, int Y) = 0;
  virtual void RemoveListener(const IPtr<IDesignSurfaceListener>& Listener) = 0;
  virtual void ShowContextMenu() = 0;
  /// Raises when the module must not change.
  virtual void ValidateModification() = 0;
  /// Reports a change of the module.
  virtual void Modified() = 0;
  /// Is `Item`, or one of its parents below the container item, selected.
  virtual bool ItemInSelections(const IPtr<ISelections>& Selections, const IPtr<IItem>& Item) = 0;
  virtual IPtr<IItem> ItemFromComponent(TComponent* Component) = 0;
};

/// The input of a surface, as the gesture engine receives it.
struct FK_API IDesignSurfaceListener : IInterface {
  FK_INTERFACE(IDesignSurfaceListener, IInterface, "{C41303AA-CAE3-11D3-AB47-00C04FB17A72}")
  /// A press on `Item` (at least the root) at surface point (X, Y). `Affects` holds the
  /// edges of the grab handle pressed, empty off the handles; `NoDrag` asks for a
  /// selection without a drag.
  virtual void MouseDown(const IPtr<IItem>& Item, TShiftState Shift, int X, int Y, bool DoubleClick,
                         TMoveAffects Affects, bool NoDrag) = 0;
  virtual void MouseMove(int X, int Y) = 0;
  virtual void MouseUp(int X, int Y) = 0;
  /// A key press (`KeyUp` false, also for repeats) or release.
  virtual void Key(TDesignKeyCode KeyCode, TShiftState Shift, char Ch, bool KeyUp) = 0;
  virtual void CancelDragging() = 0;
};

/// The gesture engine as a surface and a root see it.
struct FK_API ISurfaceDesigner : IInterface {
  FK_INTERFACE(ISurfaceDesigner, IInterface, "{BC9760BF-249C-433A-B2C9-85B59B2D3A9F}")
  /// Leaves the surface; the engine does nothing afterwards.
  virtual void Close() = 0;
  virtual void CancelDragging() = 0;
  virtual bool GetLocked() = 0;
  virtual TPoint GetGridSize() = 0;
  /// No move and no resize until `Unlock`.
  virtual void Lock() = 0;
  virtual void Modified() = 0;
  /// `Point` snapped to the grid through the surface's origin; `Force` snaps even with
  /// grid alignment off.
  virtual TPoint PointToGrid(const TPoint& Point, bool Force) = 0;
  /// Raises `EArgumentOutOfRangeException` unless both steps are positive.
  virtual void SetGridSize(const TPoint& Size) = 0;
  virtual void Unlock() = 0;
  virtual bool GetGridAligned() = 0;
  virtual void SetGridAligned(bool Value) = 0;
  virtual bool GetGuidelines() = 0;
  virtual void SetGuidelines(bool Value) = 0;
  virtual IPtr<ISelections> GetSelections() = 0;
  virtual TDragAction GetDragAction() = 0;
};

/// An item maker of a custom module; its operation belongs to the framework packages.
struct FK_API ICustomModuleItemCreator : IInterface {
  FK_INTERFACE(ICustomModuleItemCreator, IInterface, "{DDA32E0C-AB72-4AC5-9FD5-CC6055569D70}")
};

//===----------------------------------------------------------------------===//
// Free functions
//===----------------------------------------------------------------------===//

/// True for the same reference (two nulls included), false when only one is null,
/// else `A->Equals(B)`.
FK_API bool SameItem(const IPtr<IItem>& A, const IPtr<IItem>& B);
/// The object an item stands for; null for null or an item without `IPersistentItem`.
FK_API TPersistent* ExtractPersistent(const IPtr<IItem>& Item);
/// The component an item stands for, or null.
FK_API TComponent* ExtractComponent(const IPtr<IItem>& Item);

//===----------------------------------------------------------------------===//
// Classes
//===----------------------------------------------------------------------===//

FK_RESOURCESTRING(SCantDeletePersistent, "Cannot delete a persistent reference from the designer");
FK_RESOURCESTRING(SSelectionIndexError, "Selection index out of bounds (%d)");
FK_RESOURCESTRING(SUnbalancedEndSelections, "EndSelections without a matching BeginSelections");

/// The base of items that stand for a persistent. It answers to `IItem` and
/// `IPersistentItem` and has default bodies for every operation of the item family,
/// so a descendant that adds `IItemEx`, `IItem2D` or `IComponentItem` to the interfaces
/// it answers to (`FK_INTERFACES`) overrides only what differs. The persistent is not
/// owned, except that `Delete` frees it.
class FK_API TPersistentItem : public TInterfacedObject,
                               public IItem2D,
                               public IComponentItem,
                               public IPersistentItem {
  FK_CLASS(TPersistentItem, TInterfacedObject)

  explicit TPersistentItem(TPersistent* Instance = nullptr) : FInstance(Instance) {}

  bool QueryInterface(const TGUID& IID, void** Obj) override { return GetInterface(IID, Obj); }
  int AddRef() override { return ObjAddRef(); }
  int Release() override { return ObjRelease(); }
  void* GetInterfaceEntry(const TGUID& IID) override;

  // IItem
  /// False.
  bool Contains(const IPtr<IItem>& Item) override;
  /// Frees the persistent; the item stays alive with nothing behind it.
  void Delete() override;
  /// True when `Item` is a persistent item for the same instance.
  bool Equals(const IPtr<IItem>& Item) override;
  /// The empty rectangle.
  TRect GetBoundsRect() override;
  /// This item's `GetBoundsRect`, so that an override counts.
  TRect GetExtendedRect() override;
  /// (0, 0, width, height) of this item's `GetBoundsRect`.
  TRect GetClientRect() override;
  IPtr<IItem> GetParent() override;
  bool IsContainer() override;
  bool HasSelectableChildren() override;
  /// Does nothing.
  void SetBoundsRect(const TRect& Rect) override;
  /// Raises `Exception` "Cannot delete a persistent reference from the designer".
  void ValidateDeletable() override;
  /// The point unchanged.
  TPoint GlobalToLocal(const TPoint& Point) override;
  TPoint LocalToGlobal(const TPoint& Point) override;
  /// False.
  bool Selectable() override;
  /// Does nothing.
  void Edit() override;
  // IComponentItem
  /// True.
  bool DragSelectable() override;
  // IItemEx
  IPtr<IDragImage> GetDragImage() override;
  IPtr<IItemGuidelines> GetItemGuidelines() override;
  /// This item's `GetBoundsRect`.
  TRect GetPaddedBoundsRect() override;
  /// False.
  bool HasGuidelines() override;
  // IPersistentItem
  TPersistent* GetItem() override { return FInstance; }
  String GetNamePath() override;

protected:
  TPersistent* FInstance;
};

/// The palette of an engine that has none: no tool is ever armed.
class FK_API TNullTools : public TInterfacedObject, public ITools {
  FK_CLASS(TNullTools, TInterfacedObject)
  FK_INTERFACES(ITools)
  bool ToolSelected() override { return false; }
};

/// The listeners of a selection list, called from the first to the last with a count
/// read in advance: a listener must not remove another during a call.
class FK_API TSelectionListenerHelper : public TObject {
  FK_CLASS(TSelectionListenerHelper, TObject)
  /// Appends without a check for duplicates.
  void AddListener(const IPtr<ISelectionsListener>& Listener);
  /// Removes the first entry with this reference.
  void RemoveListener(const IPtr<ISelectionsListener>& Listener);
  void SelectionChanged(const IPtr<ISelections>& Selections);

private:
  std::vector<IPtr<ISelectionsListener>> FList;
};

/// A complete `ISelections`: a list of items with batches and listeners.
class FK_API TSimpleSelections : public TInterfacedObject, public ISelections {
  FK_CLASS(TSimpleSelections, TInterfacedObject)
  FK_INTERFACES(ISelections)

  TSimpleSelections();
  void BeforeDestruction() override;

  int GetCount() override { return static_cast<int>(FList.size()); }
  IPtr<IItem> GetItems(int Index) override;
  int GetSelectionLevel() override { return FBeginCount; }
  void Add(const IPtr<IItem>& Item) override;
  void AddListener(const IPtr<ISelectionsListener>& Listener) override;
  void BeginSelections() override;
  /// Empties the list and notifies, also when it was empty.
  void Clear() override;
  void EndSelections() override;
  void Remove(const IPtr<IItem>& Item) override;
  void Remove(int Index) override;
  void RemoveListener(const IPtr<ISelectionsListener>& Listener) override;
  bool Selected(const IPtr<IItem>& Item) override { return IndexOf(Item) >= 0; }
  void Toggle(const IPtr<IItem>& Item) override;
  /// The first index whose item is `SameItem` with `Item`, or -1. An item that stands
  /// for a persistent is the same item as another exactly when both stand for the same
  /// one, so a persistent that no entry stands for is answered without a scan while
  /// every entry stands for a persistent: adding n such items costs O(n), not O(n^2).
  int IndexOf(const IPtr<IItem>& Item);

private:
  void Modified();
  void Insert(const IPtr<IItem>& Item);
  void Forget(std::size_t Index);

  std::vector<IPtr<IItem>> FList;
  /// What each entry stands for (null for an item of another kind), in list order.
  std::vector<TPersistent*> FPersistents;
  /// How many entries stand for each persistent.
  std::unordered_map<TPersistent*, int> FPersistentCounts;
  /// How many entries stand for no persistent: these are compared by `Equals`.
  int FOtherCount = 0;
  TObjectGuard<TSelectionListenerHelper> FListeners;
  int FBeginCount = 0;
  bool FDirty = false;
};

} // namespace formkit
