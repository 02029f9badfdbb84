//===- inheritance/Proxies.h - Classes of designed roots made at run time ---===//
//
// A module on design stands for a class that has never been compiled. Its root
// is moved into a proxy class made at run time: a class record on the root
// base class (or on the ancestor module's proxy) with the module's class name,
// unit name and a table of published methods whose codes are small tokens,
// stored in method pointers and looked up by name but never called.
//
// A proxy counts the instances and the derived proxies that use it. Destroying
// an instance gives it back its earlier class and releases the proxy; a proxy
// goes when nothing uses it, and releases its parent proxy in turn. Tokens are
// shared by all proxies, the lowest free one first; a proxy's tokens are free
// again once it goes. Host main thread only.
//
// Example:
//   CreateSubClass(Form, "TForm1", "Unit1", TForm::StaticClass());
//   void* Code = CreateSubClassMethod(Form, "Button1Click");   // 1, the first token
//   Button->OnClick = TMethod{Code, Form};
//   RenameSubClassMethod(Form, Code, "OkClick");                // same token, new name
//   Form->Destroy();                                            // the proxy goes with it
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"

#include <string_view>

namespace formkit {

/// Raised when every method token of the generated classes is in use.
FK_EXCEPTION(EOutOfResources, Exception);
/// "Too many methods in class %s": no method token is free.
FK_RESOURCESTRING(STooManyMethods, "Too many methods in class %s");

/// Moves `Instance` into a new proxy class `ClassName` of unit `UnitName` whose parent is
/// `Metaclass`; the instance's present class is remembered and given back when the proxy
/// is left (`DestroySubClass`, or destroying the instance). `Metaclass` must be the
/// instance's class or one it descends from, else `EInvalidCast` "Class %s does not
/// descend from %s" and nothing changes. A proxy `Metaclass` counts one more user.
/// Names longer than 255 bytes are cut at a character boundary.
FK_API void CreateSubClass(TObject* Instance, const String& ClassName, const String& UnitName, TClass Metaclass);
/// `CreateSubClass` with an empty unit name.
FK_API void CreateSubClass(TObject* Instance, const String& ClassName, TClass Metaclass);
/// Moves `Instance` into the existing proxy `Metaclass` (made for another instance) when
/// `Metaclass` is a proxy that descends from the instance's present class; the proxy
/// counts one more user. Anything else does nothing.
FK_API void ChangeToProxyClass(TObject* Instance, TClass Metaclass);
/// Gives `Instance` the class it had before its proxy was made, and releases the proxy.
/// Nothing when the instance's class is not a proxy.
FK_API void DestroySubClass(TObject* Instance);
/// Renames the proxy class of `Instance`; an empty `UnitName` keeps the unit name.
/// Nothing when the instance's class is not a proxy.
FK_API void RenameSubClass(TObject* Instance, const String& ClassName, const String& UnitName);
/// The code of method `MethodName` of the class of `Instance`: the one the class or a
/// parent has (an inherited handler keeps the ancestor's token), else the lowest free
/// token, added to the proxy's own table. Null when the class is not a proxy and no
/// parent has the method. Raises `EOutOfResources` "Too many methods in class %s" when
/// every token is in use. Cost: linear in the methods of the class and its parents.
[[nodiscard]] FK_API void* CreateSubClassMethod(TObject* Instance, const String& MethodName);
/// Renames the method of code `Token`: its entry leaves the own table of the class of
/// `Instance` (if there) and comes back at the end with the new name, so method pointers
/// holding the token see the new name. Nothing when the class is not a proxy.
FK_API void RenameSubClassMethod(TObject* Instance, void* Token, const String& NewName);
/// Removes the method of code `Token` from the own table of the class of `Instance`;
/// nothing when the table does not hold it. The token stays in use until the proxy goes,
/// since event properties may still hold it.
FK_API void DestroySubClassMethod(TObject* Instance, void* Token);
/// Whether `ClassType` is a live proxy class. Cost: constant for compiled classes,
/// linear in the live proxies otherwise.
[[nodiscard]] FK_API bool IsProxyClass(TClass ClassType);
/// Whether the own method table of `ClassType` (not its parents') has a method `Name`,
/// compared without regard to case.
[[nodiscard]] FK_API bool ExistProxyMethod(TClass ClassType, std::string_view Name);
/// The instances and derived proxies that use proxy `ClassType`; 0 for any other class.
[[nodiscard]] FK_API int ProxyReferenceCount(TClass ClassType);
/// The number of live proxy classes.
[[nodiscard]] FK_API int ProxyClassCount();
/// The earlier class remembered by proxy `ClassType`: the class its instance had before;
/// null for any other class.
[[nodiscard]] FK_API TClass ProxyEarlierClass(TClass ClassType);

/// Gives the root core its generated classes: fills the class hooks of `TRootHooks`
/// (`CreateSubClass`, `RenameSubClass`, the three method hooks, `IsProxyClass`,
/// `ChangeToProxyClass`) with this unit. Live proxies are not affected by either call.
FK_API void InstallClassProxyHooks();
/// Clears the class hooks of `TRootHooks`.
FK_API void RemoveClassProxyHooks();

} // namespace formkit
