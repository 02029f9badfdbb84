//===- inheritance/UpdateManager.h - Ancestor changes reach descendants ---===//
//
// One `TUpdateManager` stands for one designed root or nested frame and its
// ancestor. Through their parent links and child lists the managers of a
// family form a tree from the oldest ancestor to the youngest descendant. When
// a module changes, its manager first takes note of what now differs from the
// ancestor (`Filter`: the module's own edits become overrides), then has each
// descendant bring itself into line with its ancestor (`Update`): components
// the ancestor added are created, those it dropped are freed, and every
// property that still follows is copied over. Renames run down the family by
// name. The root that owns the manager hears of every run through its
// `IUpdateManagerCallback`; every call to it is skipped when there is none.
//
// The root core joins through its hooks: `InstallUpdateManagerHooks()` fills
// them with the managers of this unit, `RemoveUpdateManagerHooks()` clears them.
//
// Example:
//   IPtr<TUpdateManager> Top = New<TUpdateManager>(Form1, nullptr, nullptr, nullptr);
//   IPtr<TUpdateManager> Sub =
//       New<TUpdateManager>(Form2, Form1, InterfaceOf<IUpdateManager>(Top.Get()), Notifier);
//   Button1->SetCaption("Go");        // Form1's button: the ancestor changes
//   Top->Modified();                  // Form2's Button1 says "Go" unless Form2 overrode it
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "inheritance/UpdateObjects.h"

#include <memory>
#include <optional>
#include <vector>

namespace formkit {

class TComponentRoot;
class TWriter;

FK_RESOURCESTRING(sCannotInheritFrom,
                  "Cannot inherit from '%s'.  Contains a component '%s' that does not support inheritance");
FK_RESOURCESTRING(sCannotInheritFroms,
                  "Cannot inherit from '%s'.  Contains components '%s' that do not support inheritance");
FK_RESOURCESTRING(sBlankNameMultiview,
                  "Form '%s' contains an unnamed component (of type %s). This prevents you from using multiview "
                  "features");
FK_RESOURCESTRING(sBlankName, "Cannot inherit from form '%s'. It contains a component with a blank name property");

/// What a manager is doing at this moment; a guard against re-entry, not a lock.
FK_ENUM(TUpdateMode, std::uint8_t, umNone, umUpdate, umFilter)

/// The side of a module that its update manager reports to: the root that owns the
/// manager. The manager holds it counted; it does not hold the manager.
struct FK_API IUpdateManagerCallback : IInterface {
  FK_INTERFACE(IUpdateManagerCallback, IInterface, "{ABBE7254-5495-11D1-9FB5-0020AF3D82DA}")
  /// An update run of `Manager` begins.
  virtual void Updating(const IPtr<IUpdateManager>& Manager) = 0;
  /// The run ended, also by an exception.
  virtual void Updated(const IPtr<IUpdateManager>& Manager) = 0;
  /// `Instance` is about to be freed because its twin left the ancestor.
  virtual void Deleting(const IPtr<IUpdateManager>& Manager, TPersistent* Instance) = 0;
  /// Makes an instance of `ComponentClass` owned by `Owner`; null lets the manager do it.
  virtual TComponent* UpdateManagerCreateComponent(TClass ComponentClass, TComponent* Owner) = 0;
  /// Streams the ancestor's `Component` in full into `Writer`.
  virtual void WriteComponent(TWriter* Writer, TComponent* Component) = 0;
  /// A component that an update created is complete.
  virtual void UpdateManagerComponentCreated(TComponent* Component) = 0;
  /// The class group in which new components are read; null keeps the current one.
  virtual TClass UpdateManagerClassGroup() = 0;
};

/// The update manager of one module (or nested frame) against its ancestor. Owns its
/// tree of update objects; holds neither component, nor its parent or child managers,
/// which leave its lists as they go. Host main thread only.
class FK_API TUpdateManager : public TInterfacedObject,
                              public IUpdateManager,
                              public IImplementation,
                              public TUpdateRun {
  FK_CLASS(TUpdateManager, TInterfacedObject)
  FK_INTERFACES(IUpdateManager, IImplementation)

  TUpdateManager() = default;
  /// Joins the family of `AncestorManager` (may be null) and, with an `Ancestor`, builds
  /// the tree that records what of `Component` still follows it. Cost: one walk of the
  /// module.
  TUpdateManager(TComponent* Component, TComponent* Ancestor, const IPtr<IUpdateManager>& AncestorManager,
                 const IPtr<IUpdateManagerCallback>& Notifier);
  /// Leaves the family: the descendants lose their parent and stay usable.
  void BeforeDestruction() override;
  /// Takes `Ancestor`, managed by `AncestorManager`, as the ancestor again after the
  /// ancestor's module came back from dormancy: the component it followed was replaced
  /// by the same one read from the stream. Nothing when this manager follows another.
  void JoinAncestor(TComponent* Ancestor, const IPtr<IUpdateManager>& AncestorManager);

  /// The manager behind an interface reference, or null when it is not one of these.
  [[nodiscard]] static TUpdateManager* ManagerOf(const IPtr<IInterface>& Manager);

  // IUpdateManager --------------------------------------------------------------------
  bool GetHasDescendents() override { return !FChildList.empty(); }
  /// Whether the module has an ancestor.
  [[nodiscard]] bool GetIsDescendent() const noexcept { return FAncestor != nullptr; }
  TComponent* GetComponent() const noexcept { return FComponent; }
  TComponent* GetAncestor() const noexcept { return FAncestor; }
  // IImplementation
  TObject* GetInstance() override { return this; }

  /// The module changed: its own edits become overrides, then the descendants follow.
  void Modified();
  /// Drops from the tree what now differs from the ancestor. Nothing outside `umNone`
  /// or while either side is being destroyed.
  void Filter();
  /// `Update` on each descendant's manager, in order.
  void UpdateChildren();
  /// Brings the module into line with its ancestor: frees what the ancestor dropped,
  /// creates what it added, copies what still follows, then updates the descendants.
  /// Dropped while a run of this manager is under way. Raises what a run raised, or
  /// `Exception` with the first message of a failed component release.
  void Update();
  /// True when `Name` is taken in the module or in any descendant.
  [[nodiscard]] bool NameExists(const String& Name) const;
  /// Renames an inherited component `CurName` of this module, then of its descendants.
  void RenameComponent(const String& CurName, const String& NewName);
  /// `RenameComponent` in each descendant.
  void RenameDescendents(const String& CurName, const String& NewName);
  /// Whether `PropInfo` of `Instance` can go back to the ancestor's value.
  [[nodiscard]] bool CanRevert(TPersistent* Instance, PPropInfo PropInfo);
  /// Puts `PropInfo` of `Instance` back into following and updates at once.
  void Revert(TPersistent* Instance, PPropInfo PropInfo);
  /// A removed component leaves the tree.
  void Notification(TPersistent* Instance, TOperation Operation);

  /// Brings `Component` into the updating state, once a run (`TUpdateRun`).
  void Updating(TComponent* Component) override;
  /// Marks a child that an update created, and its children, as inherited.
  void SetChildAncestor(TComponent* Child);

  // Inspection --------------------------------------------------------------------------
  TUpdateMode Mode() const noexcept { return FMode; }
  TUpdateManager* Parent() const noexcept { return FParent; }
  const std::vector<TUpdateManager*>& Children() const noexcept { return FChildList; }
  /// The tree of what still follows; null without an ancestor.
  TUpdateObject* ComponentUpdate() const noexcept { return FComponentUpdate.get(); }
  /// The root that hears of the runs; null when none was given.
  const IPtr<IUpdateManagerCallback>& Notifier() const noexcept { return FNotifier; }
  /// Called around each run, before the notifier hears of it.
  TNotifyEvent FOnUpdating;
  TNotifyEvent FOnUpdate;

protected:

private:
  void BeginUpdate();
  void EndUpdate();
  void RunUpdate();
  void ReleaseUpdated() noexcept;
  [[nodiscard]] bool EitherSideDestroying() const noexcept;
  [[nodiscard]] IPtr<IUpdateManager> AsManager();

  std::unique_ptr<TUpdateObject> FComponentUpdate;
  std::vector<TUpdateManager*> FChildList;
  TComponent* FComponent = nullptr;
  TComponent* FAncestor = nullptr;
  TUpdateManager* FParent = nullptr;
  TUpdateMode FMode = umNone;
  /// The components brought into the updating state by this run, in that order.
  std::vector<TComponent*> FUpdateList;
  IPtr<IUpdateManagerCallback> FNotifier;
  /// The first message of a failed release in the last run.
  std::optional<String> FFirstReleaseError;
};

/// Checks that a module can inherit from `Ancestor`: every component it owns supports
/// inheritance and has a name. Raises `EComponentDesignerException` with the reason.
FK_API void ValidateInheritence(TComponentRoot& Root, TComponent* Ancestor);

/// Makes the root of `Root` a copy of `Ancestor` in a generated class `ClassName` on the
/// ancestor's class: every component it gets from there is marked inherited. Checks
/// `ValidateInheritence` first, so a refused ancestor leaves the root as it was.
FK_API void InheritFrom(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor);

/// The callback of a module on design for its managers: updates keep renames open and
/// refresh the surface; a nested frame's update counts as a change of the module.
[[nodiscard]] FK_API IPtr<IUpdateManagerCallback> NewRootUpdateCallback(TComponentRoot& Root);

/// Fills the root core's hooks of inheritance (`CreateUpdateManager`, the manager's
/// operations, `ValidateInheritence`, `InheritFrom`) with this unit's.
FK_API void InstallUpdateManagerHooks();
/// Clears the hooks that `InstallUpdateManagerHooks` filled.
FK_API void RemoveUpdateManagerHooks();

} // namespace formkit
