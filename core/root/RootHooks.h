//===- core/root/RootHooks.h - Where later parts join the root core ------===//
//
// A module on design calls into subsystems that are built on top of it:
// generated classes, the update manager of inheritance, component and selection
// editors. Each joins
// by setting one hook here when its unit starts. An unset hook means that the
// service is not there: optional services are skipped, and an operation that
// cannot be done without its service raises `EComponentDesignerException`
// "%s is not available".
//
// Example (the inheritance support, as its unit starts):
//   TRootHooks::UpdateManagerNameExists = [](const IPtr<IUpdateManager>& Manager, const String& Name) {
//     return ManagerOf(Manager)->NameExists(Name);
//   };
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"

namespace formkit {

class TComponentRoot;

struct FK_API TRootHooks {
  /// Copies the ancestor's image into a new root instance and moves it to a generated
  /// class (the ancestor steps of `CreateRootInstance`).
  static std::function<void(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor)> InheritFrom;
  /// Makes the update manager of a root component (null without inheritance support).
  static std::function<IPtr<IUpdateManager>(TComponentRoot& Root, TComponent* Component,
                                            TComponent* AncestorComponent,
                                            const IPtr<IUpdateManager>& AncestorManager)>
      CreateUpdateManager;
  /// Tells an update manager of a change (`Modified`) or of a removed instance.
  /// Makes `Manager`, whose ancestor went dormant, follow `Ancestor` (managed by
  /// `AncestorManager`), the same component read back from the ancestor's stream.
  static std::function<void(const IPtr<IUpdateManager>& Manager, TComponent* Ancestor,
                            const IPtr<IUpdateManager>& AncestorManager)>
      UpdateManagerJoinAncestor;
  static std::function<void(const IPtr<IUpdateManager>& Manager)> UpdateManagerModified;
  static std::function<void(const IPtr<IUpdateManager>& Manager, TPersistent* Instance)> UpdateManagerRemoved;
  /// True when a name is taken in the module or one of its descendants.
  static std::function<bool(const IPtr<IUpdateManager>& Manager, const String& Name)> UpdateManagerNameExists;
  /// The component a manager stands for (its root component or nested frame), or null.
  static std::function<TComponent*(const IPtr<IUpdateManager>& Manager)> UpdateManagerComponent;
  /// Renames component `CurName` to `NewName` in every descendant of the manager's module,
  /// before the module renames its own.
  static std::function<void(const IPtr<IUpdateManager>& Manager, const String& CurName, const String& NewName)>
      UpdateManagerRenameDescendents;
  /// Whether property `PropInfo` of `Instance` differs from the ancestor's and can go back.
  static std::function<bool(const IPtr<IUpdateManager>& Manager, TPersistent* Instance, PPropInfo PropInfo)>
      UpdateManagerCanRevert;
  /// Puts property `PropInfo` of `Instance` back to the ancestor's value.
  static std::function<void(const IPtr<IUpdateManager>& Manager, TPersistent* Instance, PPropInfo PropInfo)>
      UpdateManagerRevert;
  /// The component editor of a component (null when none is registered).
  static std::function<IPtr<IComponentEditor>(TComponent* Component, const IPtr<IDesigner>& Designer)>
      GetComponentEditor;
  // Generated classes: the class a designed root stands for, made at run time. Method
  // codes are tokens below `MaxMethodToken`, never called.
  /// Moves a new root `Instance` to a generated class `ClassName` of unit `UnitName` that
  /// descends from `Metaclass`. Unset: the root keeps its framework class.
  static std::function<void(TComponent* Instance, const String& ClassName, const String& UnitName, TClass Metaclass)>
      CreateSubClass;
  /// Renames the generated class of `Instance`; an empty `UnitName` keeps the unit.
  static std::function<void(TComponent* Instance, const String& ClassName, const String& UnitName)> RenameSubClass;
  /// The code of method `MethodName` of the class of `Instance`: the one it or a parent
  /// has, else a new token.
  static std::function<void*(TComponent* Instance, const String& MethodName)> CreateSubClassMethod;
  /// Renames the method of code `Token` of the class of `Instance`; the token stays.
  static std::function<void(TComponent* Instance, void* Token, const String& NewName)> RenameSubClassMethod;
  /// Removes the method of code `Token` from the class of `Instance`; nothing when absent.
  static std::function<void(TComponent* Instance, void* Token)> DestroySubClassMethod;
  /// Tells the module's form editor (the tool services' view of the module) of a rename,
  /// when the module has one.
  static std::function<void(TComponentRoot& Root, TComponent* Component, const String& CurName, const String& NewName)>
      NotifyFormEditorRenamed;
  /// Whether a class is the proxy class of a module (nested frames are made from them).
  static std::function<bool(TClass Class)> IsProxyClass;
  /// Moves an instance to a proxy class.
  static std::function<void(TComponent* Instance, TClass ProxyClass)> ChangeToProxyClass;
  /// Raises when a module cannot inherit from `Ancestor`.
  static std::function<void(TComponentRoot& Root, TComponent* Ancestor)> ValidateInheritence;
  /// Brings a module up to date with its ancestor (the manager's `Update`).
  static std::function<void(const IPtr<IUpdateManager>& Manager)> UpdateManagerUpdate;
  /// Hands a named command to the host's designer command service.
  static std::function<void(const String& Command)> SendDesignerCommand;
  /// Calls `Proc` with the units the selection editors of `Component` ask for.
  static std::function<void(TComponentRoot& Root, TComponent* Component, const TGetStrProc& Proc)>
      SelectionEditorUnits;
};

/// Raises `EComponentDesignerException` "%s is not available" for the named service.
[[noreturn]] FK_API void RaiseServiceNotAvailable(const char* Service);

} // namespace formkit
