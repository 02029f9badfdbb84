//===- tests/frameworks/kiln/design/ClassFamily.h - Generated classes and descendants for tests ===//
//
// Stand-ins for what the inheritance support gives the root core through its
// hooks, built on the real class records of the platform:
//
// - `TGeneratedClasses`: each new root gets its own class, made at run time on
//   the framework's (or the ancestor module's) class; handlers are method
//   tokens of that class, the lowest free token first.
// - `TModuleFamily`: the update manager of one module, linked to its
//   ancestor's and its descendants' managers; it answers whether a name is
//   taken anywhere below, and carries a rename down the family.
// - `TInheritance`: the hooks that make a descendant module a copy of its
//   ancestor (written in full, read into the new root) and give every module a
//   `TModuleFamily`.
//
// Example:
//   TGeneratedClasses Classes;                 // roots made now get classes
//   TInheritance Family(Classes, &Log);        // and descendants inherit
//   IPtr<IRoot> Form1 = NewForm("Form1");
//   IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
//   ... // close every root before the two go
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/root/ComponentRoot.h"
#include "tests/fakes/CallLog.h"

#include <set>

namespace formkit::fakes {

/// Generated classes for designed roots; installs the root core's class hooks while it
/// lives. Keeps every record it made until it goes, so the roots must be gone first.
class TGeneratedClasses {
public:
  TGeneratedClasses();
  ~TGeneratedClasses();
  TGeneratedClasses(const TGeneratedClasses&) = delete;
  TGeneratedClasses& operator=(const TGeneratedClasses&) = delete;

  /// Moves `Instance` to a new class `ClassName` of unit `UnitName` on `Parent`.
  void CreateSubClass(TComponent* Instance, const String& ClassName, const String& UnitName, TClass Parent);
  /// The names of the methods of the class of `Instance` itself, in table order.
  static std::vector<String> OwnMethods(TComponent* Instance);

private:
  void* CreateMethod(TComponent* Instance, const String& Name);
  static TClass GeneratedClassOf(TComponent* Instance);
  std::vector<TGeneratedClass> FRecords;
  std::set<std::uintptr_t> FTokens;
};

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
/// `TModuleFamily`; `Classes` gives the classes.
class TInheritance {
public:
  TInheritance(TGeneratedClasses& Classes, TCallLog* Log);
  ~TInheritance();
  TInheritance(const TInheritance&) = delete;
  TInheritance& operator=(const TInheritance&) = delete;

  static TModuleFamily* FamilyOf(const IPtr<IUpdateManager>& Manager);

private:
  void InheritFrom(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor);
  TGeneratedClasses& FClasses;
  TCallLog* FLog;
};

} // namespace formkit::fakes
