//===- tests/frameworks/kiln/design/ClassFamily.h - Descendant modules for tests ===//
//
// Stand-ins for what the update manager gives the root core through its
// hooks. Designed roots get their classes from the real generated classes
// (inheritance/Proxies.h), whose hooks the Kiln designer package sets:
//
// - `TModuleFamily`: the update manager of one module, linked to its
//   ancestor's and its descendants' managers; it answers whether a name is
//   taken anywhere below, and carries a rename down the family.
// - `TInheritance`: the hooks that make a descendant module a copy of its
//   ancestor (a proxy class on the ancestor's, written in full, read into the
//   new root) and give every module a `TModuleFamily`.
//
// Example:
//   TInheritance Family(&Log);                 // descendants inherit
//   IPtr<IRoot> Form1 = NewForm("Form1");
//   IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
//   EXPECT_EQ(OwnMethods(Form2->GetRoot()), std::vector<String>{"Button1Click"});
//   ... // close every root before the family goes
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/root/ComponentRoot.h"
#include "tests/fakes/CallLog.h"

#include <vector>

namespace formkit::fakes {

/// The names of the methods of the class of `Instance` itself (not its parents'), in
/// table order.
std::vector<String> OwnMethods(TComponent* Instance);

/// The update manager of one module of a family. The module holds it; it does not hold
/// the module.
class TModuleFamily : public TInterfacedObject, public IUpdateManager {
  FK_CLASS(TModuleFamily, TInterfacedObject)
  FK_INTERFACES(IUpdateManager)
  TModuleFamily() = default;
  TModuleFamily(TComponentRoot* Root, TModuleFamily* Parent, TCallLog* Log);
  void BeforeDestruction() override;

  bool GetHasDescendents() override { return !FChildren.empty(); }
  TComponent* GetComponent() const { return FRoot ? FRoot->Root() : nullptr; }
  /// Whether the module or a descendant has a component `Name`.
  bool NameExists(const String& Name) const;
  /// Renames `CurName` in each descendant, logging "RenameDescendents(<module>,Cur,New)".
  void RenameDescendents(const String& CurName, const String& NewName);
  int DescendantCount() const;

private:
  void RenameComponent(const String& CurName, const String& NewName);
  TComponentRoot* FRoot = nullptr;
  TModuleFamily* FParent = nullptr;
  std::vector<TModuleFamily*> FChildren;
  TCallLog* FLog = nullptr;
};

/// Installs, while it lives, the hooks by which descendants inherit and modules get a
/// `TModuleFamily`, and gives back the hooks it found (the real update manager's, which
/// the Kiln designer package installs) when it goes. The descendant's class comes from
/// the generated classes.
class TInheritance {
public:
  explicit TInheritance(TCallLog* Log);
  ~TInheritance();
  TInheritance(const TInheritance&) = delete;
  TInheritance& operator=(const TInheritance&) = delete;

  static TModuleFamily* FamilyOf(const IPtr<IUpdateManager>& Manager);

private:
  void InheritFrom(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor);
  TCallLog* FLog;
  /// The hooks found at construction, put back at destruction.
  struct {
    decltype(TRootHooks::InheritFrom) InheritFrom;
    decltype(TRootHooks::CreateUpdateManager) CreateUpdateManager;
    decltype(TRootHooks::UpdateManagerComponent) UpdateManagerComponent;
    decltype(TRootHooks::UpdateManagerNameExists) UpdateManagerNameExists;
    decltype(TRootHooks::UpdateManagerRenameDescendents) UpdateManagerRenameDescendents;
    decltype(TRootHooks::UpdateManagerModified) UpdateManagerModified;
    decltype(TRootHooks::UpdateManagerRemoved) UpdateManagerRemoved;
    decltype(TRootHooks::UpdateManagerCanRevert) UpdateManagerCanRevert;
    decltype(TRootHooks::UpdateManagerRevert) UpdateManagerRevert;
  } FSaved;
};

} // namespace formkit::fakes
