//===- platform/Classes.h - Persistents, components, collections ---------===//
//
// `TPersistent` (what can be assigned and streamed), `TComponent` (owned,
// named, notified, flagged as on a design surface), `TCollection` with its
// items, and the process-wide class registry with class groups.
//
// Construction is two-phase: the C++ constructor only initialises members; the
// virtual `Create(Owner)` is the constructor logic, and every override calls
// `inherited::Create` first.
//
// Example:
//   TComponent* Form = CreateComponent(TMyForm::StaticClass(), nullptr);
//   TComponent* Button = CreateComponent(TMyButton::StaticClass(), Form);
//   Button->SetName("Button1");
//   Form->Destroy();   // frees Button too
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/TypInfo.h"

#include <memory>
#include <unordered_map>


namespace formkit {

class TFiler;
class TReader;
class TWriter;
class TCollection;
class TPersistent;
class TComponent;
namespace detail {
struct TPendingReferenceCount;
class TComponentReference;
} // namespace detail

FK_EXCEPTION(EComponentError, Exception);
FK_EXCEPTION(EClassNotFound, EComponentError);
FK_EXCEPTION(EFilerError, Exception);
FK_EXCEPTION(EReadError, EFilerError);
FK_EXCEPTION(EWriteError, EFilerError);
FK_EXCEPTION(EInvalidProperty, EFilerError);

FK_EVENT(TNotifyEvent, void(TObject* Sender));

/// The keys and buttons held during a mouse or key event.
FK_ENUM(TShiftStateFlag, std::uint8_t, ssShift, ssAlt, ssCtrl, ssLeft, ssRight, ssMiddle, ssDouble)
FK_SET(TShiftState, TShiftStateFlag)

/// The message of every list's index error.
FK_RESOURCESTRING(SListIndexError, "List index out of bounds (%d)");

//===----------------------------------------------------------------------===//
// TPersistent
//===----------------------------------------------------------------------===//

/// The base of everything that can be selected, assigned and streamed.
class FK_API TPersistent : public TObject {
  FK_CLASS(TPersistent, TObject)

  /// Copies `Source` into this object; the default asks `Source->AssignTo(this)`,
  /// which raises `EConvertError` "Cannot assign a %s to a %s".
  virtual void Assign(TPersistent* Source);
  /// A dotted path for display: a component's name followed by sub-object names.
  virtual String GetNamePath();
  /// Declares properties that are streamed without being published.
  virtual void DefineProperties(TFiler* Filer);
  /// The object this one belongs to for name paths; null at the top.
  virtual TPersistent* GetOwner() { return nullptr; }
  /// Forgets the stream references still waiting to be written into this object.
  void BeforeDestruction() override;

protected:
  virtual void AssignTo(TPersistent* Dest);
  [[noreturn]] void AssignError(TPersistent* Source);

private:
  friend struct detail::TPendingReferenceCount;
  /// How many unresolved references of a stream will write into this object: while it is
  /// not zero, the object's teardown tells the fix-ups to forget them.
  std::uint32_t FPendingReferences = 0;
};

namespace detail {
/// Keeps `TPersistent`'s count of pending references; only the fix-ups use it.
struct FK_API TPendingReferenceCount {
  static void Add(TPersistent* Obj) noexcept { ++Obj->FPendingReferences; }
  static void Drop(TPersistent* Obj) noexcept { --Obj->FPendingReferences; }
  static std::uint32_t Of(const TPersistent* Obj) noexcept { return Obj->FPendingReferences; }
};
/// Called by a persistent's teardown while references are pending for it.
FK_API void ForgetPendingReferences(TPersistent* Obj) noexcept;
} // namespace detail

//===----------------------------------------------------------------------===//
// TComponent
//===----------------------------------------------------------------------===//

FK_ENUM(TComponentStateFlag, std::uint8_t, csLoading, csReading, csWriting, csDestroying,
        csDesigning, csAncestor, csUpdating, csFixups, csFreeNotification, csInline,
        csDesignInstance)
FK_SET(TComponentState, TComponentStateFlag)
FK_ENUM(TComponentStyleFlag, std::uint8_t, csInheritable, csCheckPropAvail, csSubComponent,
        csTransient)
FK_SET(TComponentStyle, TComponentStyleFlag)
/// The type record of a component's `Name`, so that its editor can be registered alone.
FK_ALIAS(TComponentName, tkUString)

/// What a root gives to whoever asks `FindRootDesigner`: told of changes to its objects.
struct FK_API IDesignerNotify : IInterface {
  FK_INTERFACE(IDesignerNotify, IInterface, "{B0F61B3E-5C1A-4C1E-9E63-3D2C6A0F4E01}")
  virtual void Modified() = 0;
  virtual void Notification(TPersistent* AnObject, TOperation Operation) = 0;
  /// Asked before a component of the root (or, with `AComponent` null, the root itself)
  /// changes its name; raises to refuse.
  virtual void ValidateRename(TComponent* AComponent, const String& CurName, const String& NewName) = 0;
};

/// How a component is held through an interface. A component is not counted, so an
/// interface reference to it must not outlive it: it is handed out only as this wrapper,
/// which hears of the component's destruction and answers null from then on.
///
/// Example:
///   IPtr<IComponentReferenceSource> Ref = ComponentReference(Button);
///   Button->Destroy();
///   Ref->GetComponent();   // null, and Ref is still safe to release
struct FK_API IComponentReferenceSource : IInterface {
  FK_INTERFACE(IComponentReferenceSource, IInterface, "{E28B1858-EC86-4559-8FCD-6B4F824151ED}")
  /// The component, or null once it is gone.
  virtual TComponent* GetComponent() = 0;
};

/// The one reference wrapper of `Component` (made on first request); null for null.
FK_API IPtr<IComponentReferenceSource> ComponentReference(TComponent* Component);
/// The component behind an interface reference: the wrapper's component, or null for
/// anything else (a counted object that is not a component).
FK_API TComponent* ReferencedComponent(const IPtr<IInterface>& Reference);

namespace detail {
/// A set of components in insertion order with O(1) membership and removal, for the
/// links of `FreeNotification` (one component may be linked with many thousands).
/// Removal moves the last element into the gap. Does not own the components.
class FK_API TComponentLinks {
public:
  bool Empty() const noexcept { return FItems.empty(); }
  size_t Size() const noexcept { return FItems.size(); }
  /// Adds `C` unless present.
  void Add(TComponent* C);
  /// Removes `C` if present; returns whether it was.
  bool Remove(TComponent* C) noexcept;
  /// Removes and returns the last component; the set must not be empty.
  TComponent* PopBack() noexcept;
  bool Contains(TComponent* C) const noexcept;

private:
  /// Below this size a scan is cheaper than the index.
  static constexpr size_t IndexFrom = 16;
  void BuildIndex();
  std::vector<TComponent*> FItems;
  std::unique_ptr<std::unordered_map<TComponent*, size_t>> FIndex; // built past IndexFrom
};

/// The owned components by name, without regard to case: an open-addressed table of
/// (hash, component) pairs, so a lookup touches one cache line and the name it finds.
/// Does not own the components; unnamed components are not held.
class FK_API TNameIndex {
public:
  /// The component named `Name`, or null. Complexity: O(1) on average.
  TComponent* Find(std::string_view Name) const noexcept;
  /// Adds a named component that is not held yet.
  void Insert(TComponent* Component);
  /// Removes the component if held under its current name.
  void Erase(TComponent* Component) noexcept;
  void Clear() noexcept;
  bool Empty() const noexcept { return FCount == 0; }

private:
  struct Slot {
    std::uint64_t Hash = 0;
    TComponent* Component = nullptr;
  };
  void Grow();
  std::vector<Slot> FSlots; // size is zero or a power of two
  size_t FCount = 0;        // live entries
  size_t FUsed = 0;         // live entries and tombstones
};
} // namespace detail

/// Called for each child in stream order by `GetChildren`.
using TGetChildProc = std::function<void(TComponent* Child)>;

/// An owned, named component. Not counted: it is held through an interface only by its
/// `ComponentReference` wrapper. Its own interface references keep a tally; destroying a
/// component that is still referenced that way reports it through
/// `DanglingComponentReferenceHook` and keeps its memory until the last such reference
/// goes, so the late release is safe.
class FK_API TComponent : public TPersistent, public IInterface {
  FK_CLASS(TComponent, TPersistent)
  FK_INTERFACES(IInterface)

  /// The constructor logic: joins `AOwner`'s components. Overrides call it first.
  virtual void Create(TComponent* AOwner);

  // Ownership ---------------------------------------------------------------
  TComponent* Owner() const noexcept { return FOwner; }
  int ComponentCount() const noexcept { return static_cast<int>(FComponents.size()); }
  /// The owned component at `Index`; raises `EListError` when out of range.
  TComponent* Components(int Index) const;
  /// The position among the owner's components, or -1 without owner.
  int ComponentIndex() const;
  void SetComponentIndex(int Index);
  /// The owned component named `Name` without regard to case, or null. Complexity: O(1).
  TComponent* FindComponent(std::string_view Name) const;
  /// Adds `Component` to the owned components (validating its name) and notifies.
  void InsertComponent(TComponent* Component);
  /// Removes `Component` from the owned components and notifies.
  void RemoveComponent(TComponent* Component);
  /// Frees the owned components from the last to the first. They are not told of each
  /// other's removal: they all go. Complexity: O(n).
  void DestroyComponents();

  // Names -------------------------------------------------------------------
  const String& Name() const noexcept { return FName; }
  /// Validates the identifier, then asks `ValidateRename` for duplicates; raises
  /// `EComponentError` "'%s' is not a valid component name" or
  /// "A component named %s already exists".
  virtual void SetName(const String& NewName);
  /// Sets the name without validation or notification.
  void ChangeName(const String& NewName);
  /// Checks a rename of `Component` (owned by this one; null for this one's own name) for
  /// duplicates; on a design surface the root's designer is asked too.
  virtual void ValidateRename(TComponent* Component, const String& CurName, const String& NewName);

  // Notifications -----------------------------------------------------------
  /// Told when a component is inserted into or removed from this one, when a sibling is
  /// removed from the owner, or when a component this one asked `FreeNotification` of
  /// is going away. Overrides call the inherited one.
  virtual void Notification(TComponent* AComponent, TOperation Operation);
  /// Calls the class record's notification hook, then `Notification`.
  void SendNotification(TComponent* AComponent, TOperation Operation);
  /// Asks to be told (through `Notification` with `opRemove`) when `AComponent` goes away.
  void FreeNotification(TComponent* AComponent);
  void RemoveFreeNotification(TComponent* AComponent);

  // Streaming and children --------------------------------------------------
  /// Called once the component and its siblings have been read.
  virtual void Loaded();
  /// Enters the updating state (`csUpdating`) while something else rewrites the
  /// component's properties; a widget may hold back its repainting until `Updated`.
  virtual void Updating();
  /// Leaves the updating state.
  virtual void Updated();
  /// Calls `Proc` for each child written under this component, in stream order; `Root`
  /// is the root being written.
  virtual void GetChildren(const TGetChildProc& Proc, TComponent* Root);
  /// Moves `Child` to `Order` among the children (stream order).
  virtual void SetChildOrder(TComponent* Child, int Order);
  /// The component this one is nested under in a stream (its parent); null by default.
  virtual TComponent* GetParentComponent() { return nullptr; }
  virtual bool HasParent() { return false; }
  /// Makes `AParent` the parent component (widgets override).
  virtual void SetParentComponent(TComponent* AParent);
  /// Reads this component's properties and children (`TReader::ReadData`).
  virtual void ReadState(TReader* Reader);
  /// Writes this component's prefix, properties and children (`TWriter::WriteData`).
  virtual void WriteState(TWriter* Writer);
  /// Defines "Left" and "Top": the design position kept in `DesignInfo`.
  void DefineProperties(TFiler* Filer) override;

  // State -------------------------------------------------------------------
  TComponentState ComponentState() const noexcept { return FComponentState; }
  TComponentStyle ComponentStyle() const noexcept { return FComponentStyle; }
  void SetComponentStyle(TComponentStyle Style) noexcept { FComponentStyle = Style; }
  /// Marks as on a design surface; with `SetChildren`, the owned components too.
  void SetDesigning(bool Value, bool SetChildren = true);
  void SetDesignInstance(bool Value);
  void SetAncestor(bool Value);
  void SetInline(bool Value);
  void SetLoading(bool Value);
  void SetReading(bool Value);
  void SetWriting(bool Value);
  bool IsDesigning() const noexcept { return FComponentState.Contains(csDesigning); }

  /// The designer the root of this component was given; null off a design surface.
  virtual IPtr<IDesignerNotify> GetDesigner();
  /// A free value for the component's user.
  int Tag() const noexcept { return FTag; }
  void SetTag(int Value) noexcept { FTag = Value; }
  /// Packed position of a non-visual component on a design surface (left in the low
  /// 16 bits, top in the high 16 bits).
  std::int32_t DesignInfo() const noexcept { return FDesignInfo; }
  void SetDesignInfo(std::int32_t Value) noexcept { FDesignInfo = Value; }

  String GetNamePath() override;
  TPersistent* GetOwner() override { return FOwner; }
  int ObjAddRef() override { return ++FRefTally; }
  /// Drops a tally; the last release of a component destroyed while referenced frees it.
  int ObjRelease() override;
  int InterfaceTally() const noexcept { return FRefTally; }

  void BeforeDestruction() override;

protected:
  void Destroying() override;
  /// Keeps the memory while the tally is not zero (see `DanglingComponentReferenceHook`).
  void FreeInstance() override;
  void SetComponentStateFlag(TComponentStateFlag Flag, bool Value) noexcept;

private:
  friend FK_API void FreeComponentsTogether(const std::vector<TComponent*>& Components);
  friend FK_API IPtr<IComponentReferenceSource> ComponentReference(TComponent* Component);
  friend class detail::TComponentReference;
  void Insert(TComponent* Component);
  void Remove(TComponent* Component);
  void IndexName(TComponent* Component);
  void UnindexName(TComponent* Component);
  void ForgetFreeNotification(TComponent* Component);

  TComponent* FOwner = nullptr;
  String FName;
  int FTag = 0;
  std::int32_t FDesignInfo = 0;
  int FRefTally = 0;
  TComponentState FComponentState;
  TComponentStyle FComponentStyle{csInheritable};
  /// Set while owned components leave together: the others need not hear of it.
  bool FQuietRemovals = false;
  /// Set once torn down while still referenced: the last release frees the memory.
  bool FAwaitingRelease = false;
  std::vector<TComponent*> FComponents;
  detail::TNameIndex FNameIndex;
  detail::TComponentLinks FFreeNotifies;
  /// The wrapper handed out by `ComponentReference`; plain back reference, it owns itself.
  detail::TComponentReference* FReference = nullptr;
};

/// Frees components that go away together, in the order given, which must put each
/// component before its owner. The owner of each is told of its removal, their other
/// owned components are not: nothing but what `FreeNotification` links (and those are
/// told) may hold a plain reference to them. Used to drop what a failed read created.
/// Complexity: O(n) plus the teardowns.
FK_API void FreeComponentsTogether(const std::vector<TComponent*>& Components);

/// Told when a component is destroyed while interface references to it remain:
/// (class name, count). The default writes "Instance of Class %s has dangling reference
/// count of %d" to the standard error stream, and in a build made with
/// `FK_ABORT_ON_DANGLING_REFERENCE` (the test build) aborts: it is a programming error.
/// Either way the memory stays until the last reference goes, so nothing is corrupted.
FK_API extern std::function<void(const String& ClassName, int Count)> DanglingComponentReferenceHook;

/// Allocates a component of `Class` and runs its constructor with `Owner`: the class
/// call of the virtual constructor. A constructor that throws destroys the instance.
FK_API TComponent* CreateComponent(TClass Class, TComponent* Owner);
/// Runs the constructor on an instance that `NewInstance` made, so flags set in between
/// are seen by it. A constructor that throws destroys the instance and the exception passes on.
FK_API void RunConstructor(TComponent* Instance, TComponent* Owner);

/// The class call for a compiled class: `New<TButton>(Owner)` in component form.
template <class T> T* CreateComponentOf(TComponent* Owner) {
  return static_cast<T*>(CreateComponent(T::StaticClass(), Owner));
}

//===----------------------------------------------------------------------===//
// Collections
//===----------------------------------------------------------------------===//

/// One item of a collection; created by the collection through its item class.
class FK_API TCollectionItem : public TPersistent {
  FK_CLASS(TCollectionItem, TPersistent)

  /// The constructor logic: joins `ACollection`. Overrides call it first.
  virtual void Create(TCollection* ACollection);
  TCollection* Collection() const noexcept { return FCollection; }
  /// Moves the item into another collection (or none).
  void SetCollection(TCollection* Value);
  int ID() const noexcept { return FID; }
  int Index() const;
  void SetIndex(int Value);
  /// The name shown for the item; by default its class name.
  virtual String GetDisplayName();
  String GetNamePath() override;
  TPersistent* GetOwner() override;
  void BeforeDestruction() override;

protected:
  /// Tells the collection that this item (or, with `AllItems`, every item) changed.
  void Changed(bool AllItems);

private:
  friend class TCollection;
  TCollection* FCollection = nullptr;
  int FID = 0;
};

/// A list of items of one class, owned by a component's property.
class FK_API TCollection : public TPersistent {
  FK_CLASS(TCollection, TPersistent)

  TCollection() = default;
  explicit TCollection(TClass ItemClass) : FItemClass(ItemClass) {}

  TClass ItemClass() const noexcept { return FItemClass; }
  int Count() const noexcept { return static_cast<int>(FItems.size()); }
  /// The item at `Index`; raises `EListError` "List index out of bounds (%d)".
  TCollectionItem* Items(int Index) const;
  /// Creates a new item at the end.
  TCollectionItem* Add();
  /// Creates a new item at `Index`.
  TCollectionItem* Insert(int Index);
  void Delete(int Index);
  void Clear();
  TCollectionItem* FindItemID(int ID) const;
  /// The number of columns an editor lists the items in; 0 for one column of display names.
  virtual int GetAttrCount() { return 0; }
  /// The caption of column `Index`; empty by default.
  virtual String GetAttr(int /*Index*/) { return String(); }
  /// The text of item `ItemIndex` in column `Index`; by default its display name.
  virtual String GetItemAttr(int Index, int ItemIndex);
  void BeginUpdate() noexcept { ++FUpdateCount; }
  void EndUpdate();
  int UpdateCount() const noexcept { return FUpdateCount; }
  /// Replaces the items with copies of `Source`'s (a collection) items.
  void Assign(TPersistent* Source) override;
  /// "Owner.Property", the owner's path and the name of the property holding this collection.
  String GetNamePath() override;
  TPersistent* GetOwner() override { return nullptr; }
  void BeforeDestruction() override;

protected:
  /// Called after a change to `Item`, or to all items when null, outside updates.
  virtual void Update(TCollectionItem* Item);
  void Changed();

private:
  friend class TCollectionItem;
  void InsertItem(TCollectionItem* Item);
  void RemoveItem(TCollectionItem* Item);

  TClass FItemClass = nullptr;
  std::vector<TCollectionItem*> FItems;
  int FNextID = 0;
  int FUpdateCount = 0;
};

/// A collection that knows the persistent it belongs to.
class FK_API TOwnedCollection : public TCollection {
  FK_CLASS(TOwnedCollection, TCollection)
  TOwnedCollection() = default;
  TOwnedCollection(TPersistent* AOwner, TClass ItemClass) : TCollection(ItemClass), FOwner(AOwner) {}
  TPersistent* GetOwner() override { return FOwner; }

private:
  TPersistent* FOwner = nullptr;
};

//===----------------------------------------------------------------------===//
// Class registry
//===----------------------------------------------------------------------===//

/// Registers a class by name in the group of its class (`ClassGroupOf`). Registering
/// another class of the same name in the same group raises `EComponentError`
/// "A class named %s already exists".
FK_API void RegisterClass(TClass Class);
FK_API void RegisterClasses(std::initializer_list<TClass> Classes);
FK_API void UnRegisterClass(TClass Class);
/// The class of that name in the current group or the base group; null when absent.
FK_API TClass GetClass(std::string_view ClassName);
/// Like `GetClass`, but raises `EClassNotFound` "Class %s not found".
FK_API TClass FindClass(std::string_view ClassName);

/// Starts a class group represented by `Group`; `Group` and its descendants belong to it
/// unless a later group claims them.
FK_API void StartClassGroup(TClass Group);
/// Puts `Class` and its descendants into the group of `GroupClass`.
FK_API void GroupDescendentsWith(TClass Class, TClass GroupClass);
/// The class that represents the group of `Class`; `TPersistent` for the base group.
FK_API TClass ClassGroupOf(TClass Class);
FK_API TClass ClassGroupOf(const TObject* Instance);
/// Makes the group of `Class` the current one; returns the class that represented the
/// current group before, also when the group does not change.
FK_API TClass ActivateClassGroup(TClass Class);
/// The class that represents the current class group.
FK_API TClass CurrentClassGroup();

/// Finds registered classes by name in the class group of one class and in the base
/// group, whatever group is current; with `IncludeActiveGroups`, in the current group too.
class FK_API TClassFinder : public TObject {
  FK_CLASS(TClassFinder, TObject)
  TClassFinder() = default;
  explicit TClassFinder(TClass AClass, bool IncludeActiveGroups = false)
      : FClass(AClass), FIncludeActiveGroups(IncludeActiveGroups) {}
  /// The class the finder was made for.
  TClass ForClass() const noexcept { return FClass; }
  /// The registered class named `ClassName` (any case), or null.
  [[nodiscard]] TClass GetClass(std::string_view ClassName) const;

private:
  TClass FClass = nullptr;
  bool FIncludeActiveGroups = false;
};

/// The group of the design package being loaded: registrations record it so that the
/// package's registrations can be dropped when it unloads. -1 outside any package.
FK_API extern int CurrentGroup;

/// The hook behind `RegisterNoIcon`; the design core installs its handler at start.
FK_API extern std::function<void(const std::vector<TClass>& Classes)> RegisterNoIconProc;
/// Passes `Classes` to `RegisterNoIconProc` when it is set.
FK_API void RegisterNoIcon(const std::vector<TClass>& Classes);

/// Walks up the owners of `Obj` to the root and returns the designer that root was
/// given; null when the object is not on a design surface.
FK_API IPtr<IDesignerNotify> FindRootDesigner(TPersistent* Obj);
/// Resolves a dotted path of component names below `Root`, reaching through nested
/// components; null when a step is missing.
FK_API TComponent* FindNestedComponent(TComponent* Root, std::string_view Path);

} // namespace formkit
