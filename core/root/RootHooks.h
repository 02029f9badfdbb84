//===- core/root/RootHooks.h - Where later parts join the root core ------===//
//
// A module on design calls into subsystems that are built on top of it:
// reading and writing modules, generated classes, the update manager of
// inheritance, deletion, methods in the source, component editors. Each joins
// by setting one hook here when its unit starts. An unset hook means that the
// service is not there: optional services are skipped, and an operation that
// cannot be done without its service raises `EComponentDesignerException`
// "%s is not available".
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"

namespace formkit {

class TComponentRoot;

struct FK_API TRootHooks {
  /// Reads a module from `Stream` into the root (`CreateFromStream`); `Ancestor` may be null.
  static std::function<void(TComponentRoot& Root, TStream* Stream, const IPtr<IRoot>& Ancestor)> ReadModule;
  /// Copies the ancestor's image into a new root instance and moves it to a generated
  /// class (the ancestor steps of `CreateRootInstance`).
  static std::function<void(TComponentRoot& Root, const String& ClassName, TComponent* Ancestor)> InheritFrom;
  /// Makes the update manager of a root component (null without inheritance support).
  static std::function<IPtr<IUpdateManager>(TComponentRoot& Root, TComponent* Component,
                                            TComponent* AncestorComponent,
                                            const IPtr<IUpdateManager>& AncestorManager)>
      CreateUpdateManager;
  /// Tells an update manager of a change (`Modified`) or of a removed instance.
  static std::function<void(const IPtr<IUpdateManager>& Manager)> UpdateManagerModified;
  static std::function<void(const IPtr<IUpdateManager>& Manager, TPersistent* Instance)> UpdateManagerRemoved;
  /// True when a name is taken in the module or one of its descendants.
  static std::function<bool(const IPtr<IUpdateManager>& Manager, const String& Name)> UpdateManagerNameExists;
  /// The component editor of a component (null when none is registered).
  static std::function<IPtr<IComponentEditor>(TComponent* Component, const IPtr<IDesigner>& Designer)>
      GetComponentEditor;
  /// Adds a method of `Name` to the root's generated class and gives its code.
  static std::function<void*(TComponentRoot& Root, const String& Name)> CreateSubClassMethod;
  /// Deletes the selection (clipboard and deletion).
  static std::function<void(TComponentRoot& Root, bool DoAll)> DeleteSelection;
  /// Writes the module and its dependencies (used by `Save`).
  static std::function<void(TComponentRoot& Root)> SaveModule;
  /// Whether a class is the proxy class of a module (nested frames are made from them).
  static std::function<bool(TClass Class)> IsProxyClass;
  /// Moves an instance to a proxy class.
  static std::function<void(TComponent* Instance, TClass ProxyClass)> ChangeToProxyClass;
  /// Raises when a module cannot inherit from `Ancestor`.
  static std::function<void(TComponentRoot& Root, TComponent* Ancestor)> ValidateInheritence;
  /// Reads component data from `Stream` into `Instance` (a root or a nested frame).
  static std::function<void(TComponentRoot& Root, TComponent* Instance, TStream* Stream)> ReadObjectFromStream;
};

/// Raises `EComponentDesignerException` "%s is not available" for the named service.
[[noreturn]] FK_API void RaiseServiceNotAvailable(const char* Service);

} // namespace formkit
