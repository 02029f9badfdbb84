//===- inheritance/UpdateObjects.h - What still follows the ancestor -------===//
//
// When a module inherits from another, each of its objects that came from the
// ancestor has a twin there. A `TUpdateObject` records one such pair and answers
// which properties of the descendant's object still follow the ancestor: the
// published ones in its property list, the defined ones in its `TUpdateFiler`,
// its collection as a whole, and the order of its children. The list narrows by
// comparison after every edit of the descendant (`Filter`); when the ancestor
// changes, exactly what is in it is copied over (`Update`). Update objects form
// a tree that mirrors ownership and sub-objects; the update manager holds its root.
//
// Example:
//   auto* Tree = new TUpdateObject(nullptr, Form, AncestorForm, nullptr, true, true);
//   Form->SetCaption("Mine");          // an override
//   Tree->Filter();                    // Caption no longer follows
//   AncestorForm->SetColor(clRed);
//   Tree->Update(Run);                 // Color follows, Caption stays "Mine"
//   Tree->Revert(Form, CaptionProp);   // Caption follows again from the next Update
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

#include <unordered_map>
#include <vector>

namespace formkit {

class TUpdateFiler;

/// The side of an update run that update objects call back: the update manager brings
/// each component it touches into the updating state, once a run.
class FK_API TUpdateRun {
public:
  /// Called with each component before its properties are updated.
  virtual void Updating(TComponent* Component) = 0;

protected:
  ~TUpdateRun() = default;
};

/// One descendant object paired with its twin in the ancestor, and what of it still
/// follows the twin. Owns its children and its `TUpdateFiler`; owns neither object.
/// Created with `new`: a child joins its owner's list and leaves it when deleted.
class FK_API TUpdateObject final {
public:
  /// Pairs `Obj` with `Ancestor` under `Owner` (null for the root of a tree). `PropInfo`
  /// is the property of `Owner`'s object that holds `Obj`, null for a component child.
  /// With `Compare` false everything counts as following at first (the object was just
  /// created from its ancestor); every later filter compares. `IsRoot` makes a component
  /// resolve its references against itself. Builds the children for sub-objects and for
  /// inherited child components, then filters. Cost: one walk of the object's tree.
  TUpdateObject(TUpdateObject* Owner, TPersistent* Obj, TPersistent* Ancestor, PPropInfo PropInfo, bool Compare,
                bool IsRoot);
  /// Leaves the owner's list and frees the children, from the last to the first.
  ~TUpdateObject();
  TUpdateObject(const TUpdateObject&) = delete;
  TUpdateObject& operator=(const TUpdateObject&) = delete;

  /// Drops from the lists whatever now differs from the ancestor, in this object and
  /// all below it. What is dropped stays dropped, except through `Revert`.
  void Filter();
  /// Copies the ancestor's values of what still follows into the descendant, in this
  /// object and all below it; moves children whose order follows. Nothing is caught: a
  /// setter that raises ends the update there, and the lists stay as they were.
  void Update(TUpdateRun& Manager);
  /// Puts `PropInfo` of `Instance` (this object or one below) back into following; the
  /// next `Update` copies the ancestor's value. False when `Instance` is not in the tree.
  bool Revert(TPersistent* Instance, PPropInfo PropInfo);
  /// Whether `PropInfo` of `Instance` could be reverted. `Continue` turns false once the
  /// object of `Instance` has answered.
  bool CanRevert(TPersistent* Instance, PPropInfo PropInfo, bool& Continue);
  /// Frees the update object of `Component`, wherever it is in the tree. True when that
  /// was this object itself, which its holder must then forget.
  [[nodiscard]] bool ComponentDelete(TComponent* Component);
  /// The update object whose descendant or ancestor object is `Component`: this one, a
  /// direct child, then depth first. Null when none.
  TUpdateObject* FindChild(TComponent* Component);
  /// The direct child that stands for the sub-object held in `PropInfo`; null for none.
  TUpdateObject* FindChildProp(PPropInfo PropInfo);

  // Inspection --------------------------------------------------------------
  TUpdateObject* Owner() const noexcept { return FOwner; }
  TPersistent* Object() const noexcept { return FObject; }
  TPersistent* Ancestor() const noexcept { return FAncestor; }
  /// The components against which references resolve on each side.
  TComponent* ObjectOwner() const noexcept { return FObjectOwner; }
  TComponent* AncestorOwner() const noexcept { return FAncestorOwner; }
  /// The property of the owner's object that holds this sub-object; null otherwise.
  PPropInfo PropInfo() const noexcept { return FPropInfo; }
  /// The published properties that still follow, in class order.
  const std::vector<PPropInfo>& PropList() const noexcept { return FPropList; }
  /// True when the published property named `Name` (without regard to case) follows.
  [[nodiscard]] bool Follows(std::string_view Name) const;
  const std::vector<TUpdateObject*>& Children() const noexcept { return FChildList; }
  /// The defined properties that still follow.
  TUpdateFiler& UpdateFiler() const noexcept { return *FUpdateFiler.Get(); }
  bool IsComponent() const noexcept { return FIsComponent; }
  bool IsCollection() const noexcept { return FIsCollection; }
  /// The collection still equals the ancestor's.
  bool UpdateCollection() const noexcept { return FUpdateCollection; }
  /// This child's position among its parent's children still follows the ancestor.
  bool UpdateOrder() const noexcept { return FUpdateOrder; }

private:
  void SetOwners(TUpdateObject* Owner, bool IsRoot);
  void AddSubObjects();
  void AddChild(TComponent* Child);
  void ValidateObjects();
  bool KeepsProperty(PPropInfo Prop);
  bool EqualsAncestor(PPropInfo Prop);
  void FilterOrder();
  void UpdateProperty(PPropInfo Prop, TUpdateRun& Manager);
  void UpdateOrderOfChildren();
  void UpdateCollectionItems();
  TComponent* GetAncestorPointer(TObject* Value) const;
  TComponent* GetAncestorReference(PPropInfo Prop) const;
  TMethod GetAncestorMethod(PPropInfo Prop) const;
  void DropChildren() noexcept;
  void Detach() noexcept;

  TUpdateObject* FOwner = nullptr;
  TPersistent* FObject = nullptr;
  TPersistent* FAncestor = nullptr;
  TComponent* FObjectOwner = nullptr;
  TComponent* FAncestorOwner = nullptr;
  std::vector<PPropInfo> FPropList;
  std::vector<TUpdateObject*> FChildList;
  /// The direct children by their descendant's and their ancestor's object, so that
  /// pairing the children of a parent of many costs one look-up each. A hint only: an
  /// entry is checked before use, and a miss falls back to the walk of the list.
  std::unordered_map<const TPersistent*, TUpdateObject*> FChildIndex;
  /// Owned: the defined properties that still follow.
  TObjectGuard<TUpdateFiler> FUpdateFiler;
  bool FIsComponent = false;
  bool FIsCollection = false;
  bool FUpdateCollection = true;
  bool FUpdateOrder = true;
  int FOrder = -1;
  PPropInfo FPropInfo = nullptr;
  bool FCompare = false;
};

} // namespace formkit
