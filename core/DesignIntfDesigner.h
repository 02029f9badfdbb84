//===- core/DesignIntfDesigner.h - The designer interface chain ----------===//
//
// `IDesigner` and its frozen versions: the interface of a designed module as
// editors and tool windows see it. Each version adds at its end; the plain name
// is the newest. Included by DesignIntf.h.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

struct IOTABasePaletteItem;

/// Called for each module of the project with the host's module information.
using TGetModuleProc = std::function<void(const IPtr<IInterface>& ModuleInfo)>;

/// The first frozen version of the designer interface. A module on design implements
/// the chain (the core's root; a surface answers for it by delegating); editors, tool
/// windows and the host call it, on the user-interface thread. A module hands out its
/// own components and persistents: callers must not free them, and a pointer is good
/// only while the component lives. Callbacks are called during the operation only.
/// Operations that change the module raise to refuse (the host's `CheckWritable`,
/// "Source is read-only") and then leave it as it was.
struct FK_API IDesigner60 : IDesignerNotify {
  FK_INTERFACE(IDesigner60, IDesignerNotify, "{2ADE84E1-AB8D-5452-9059-C8A4C724F797}")
  // Notification
  /// Shows the module and makes it its designer's active module (which activates the
  /// designer in `Designers`).
  virtual void Activate() = 0;
  // Methods of the designed class
  /// Adds method `Name` of the method type `TypeData` to the source (through the host's
  /// module record) and gives it bound to the root: the code of the designed class's
  /// method of that name, made in the class when it has none yet. An empty name gives an
  /// unassigned method. Raises what the host's `CheckWritable` raises.
  virtual TMethod CreateMethod(const String& Name, const TTypeData* TypeData) = 0;
  /// The same with the signature described by `EventInfo`.
  virtual TMethod CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) = 0;
  /// The name of `Method` when it is a method of this module's root; empty otherwise.
  virtual String GetMethodName(const TMethod& Method) = 0;
  /// Calls `Proc` with each method of the source whose signature fits `TypeData`: the
  /// value list of an event property.
  virtual void GetMethods(const TTypeData* TypeData, const TGetStrProc& Proc) = 0;
  /// Whether the source has a method `Name`, of any signature.
  virtual bool MethodExists(const String& Name) = 0;
  /// Renames method `CurName` of the source to `NewName`.
  virtual void RenameMethod(const String& CurName, const String& NewName) = 0;
  /// Shows method `Name` in the code editor.
  virtual void ShowMethod(const String& Name) = 0;
  /// Inserts into handler `MethodName` a call to handler `InstanceMethod` of component
  /// `InstanceName`, of the method type `TypeData`.
  virtual void ChainCall(const String& MethodName, const String& InstanceName,
                         const String& InstanceMethod, const TTypeData* TypeData) = 0;
  // Selection
  /// Adds the selected persistents to `List`, in order; the root component when nothing
  /// is selected, unless the module asked for an empty selection (`NoSelection`).
  virtual void GetSelections(const IPtr<IDesignerSelections>& List) = 0;
  /// Makes the selection exactly the persistents of `List` that stand on the surface, in
  /// one change. Ignored while the selection is in the middle of a change (a list that
  /// comes back from a listener).
  virtual void SetSelections(const IPtr<IDesignerSelections>& List) = 0;
  /// Selects `Instance` alone. A component of another module activates, shows and
  /// selects in that module.
  virtual void SelectComponent(TPersistent* Instance) = 0;
  /// The same for a design object that wraps a persistent; any other design object is
  /// ignored.
  virtual void SelectComponent(const IPtr<IDesignObject>& Instance) = 0;
  /// Empties the selection; `GetSelections` then gives the root component.
  virtual void ClearSelection() = 0;
  /// Empties the selection and keeps it empty: `GetSelections` then gives nothing.
  virtual void NoSelection() = 0;
  /// Deletes the selected components (all of them when `ADoAll`), keeping them for an
  /// undelete. Raises `EComponentDesignerException` when deleting is not available or
  /// the module refuses.
  virtual void DeleteSelection(bool ADoAll) = 0;
  // Names and lookups
  /// A name for a new component of class `BaseName` ("TButton" gives "Button1",
  /// "Button2", ...) that no component of the module or of its descendants has.
  virtual String UniqueName(const String& BaseName) = 0;
  /// The component of that name: one of the module's (a dotted path reaches into nested
  /// frames), "Form2.Button1" one of the open module whose root is Form2, a bare root name
  /// that root component of any open module; null when none.
  virtual TComponent* GetComponent(const String& Name) = 0;
  /// The name by which this module refers to `Component`: its name when the module owns
  /// it (or it is a root), else its owner's name path, a point and its name
  /// ("Frame1.Button1", "Form2.Button1"); empty for null.
  virtual String GetComponentName(TComponent* Component) = 0;
  /// Calls `Proc` with the name of each named component whose class fits the class type
  /// `TypeData` (any class when null): the module's own, those of its nested frames
  /// ("Frame1.Button1"), then those of the modules it links to ("Form2", "Form2.Button1").
  /// The value list of a reference property.
  virtual void GetComponentNames(const TTypeData* TypeData, const TGetStrProc& Proc) = 0;
  /// The persistent of that name, as `GetComponent` finds it.
  virtual TPersistent* GetObject(const String& Name) = 0;
  /// The name of `Instance`: as `GetComponentName` for a component; for an object below
  /// a component, that component's name followed by the rest of the name path
  /// ("Frame1.Button1.Font").
  virtual String GetObjectName(TPersistent* Instance) = 0;
  /// As `GetComponentNames`.
  virtual void GetObjectNames(const TTypeData* TypeData, const TGetStrProc& Proc) = 0;
  /// The root component, owned by the module; null while it is dormant or closed.
  virtual TComponent* GetRoot() = 0;
  /// The class name of the module's root: the designed class ("TForm1") once the root
  /// exists, else the framework's root class. Raises `EComponentDesignerException`
  /// "Root class not found: "%s"" when there is no root and its designer has no
  /// registration for the class.
  virtual String GetRootClassName() = 0;
  // Linking across modules
  /// Whether this module may refer to `Component` as things stand: it belongs to this
  /// module or to a module this one links to. Asks the host for the links.
  virtual bool IsComponentLinkable(TComponent* Component) = 0;
  /// Lets this module refer to `Component` of another module: the host adds the other
  /// module to the source.
  virtual void MakeComponentLinkable(TComponent* Component) = 0;
  /// Whether `Component` is one the inspector does not list (a transient one).
  virtual bool IsComponentHidden(TComponent* Component) = 0;
  /// Calls `Proc` with the host's information on each module of the project.
  virtual void GetProjectModules(const TGetModuleProc& Proc) = 0;
  /// The designer interface of the module this one inherits from; null without one.
  virtual IPtr<IDesigner> GetAncestorDesigner() = 0;
  /// The root component of the open module of root class `Name`, opened through the host
  /// when need be; null when there is none.
  virtual TComponent* FindRootAncestor(const String& Name) = 0;
  /// The module's implementation, interface and form file names, from the host's module
  /// record; empty for those it does not have (the form file is the module's own file
  /// then).
  virtual void ModuleFileNames(String& ImplFileName, String& IntfFileName, String& FormFileName) = 0;
  // Creating
  /// Creates a component of `ComponentClass` under `Parent` at (`Left`, `Top`) of that
  /// size, snapped to the grid; without a parent, in the current parent at a free spot.
  /// It is named, selected, and the module modified. Raises, with nothing left behind,
  /// when the module or the class refuses.
  virtual TComponent* CreateComponent(TClass ComponentClass, TComponent* Parent, int Left, int Top,
                                      int Width, int Height) = 0;
  /// Creates a component of `ComponentClass` under `Parent` that keeps the bounds its
  /// class gives it.
  virtual TComponent* CreateChild(TClass ComponentClass, TComponent* Parent) = 0;
  /// Creates the host's armed palette tool under `Parent` in `Rect` (a click or a drag),
  /// then tells the host the tool was used, also when the creation failed. Null without
  /// an armed tool.
  virtual TComponent* CreateCurrentComponent(TComponent* Parent, const TRect& Rect) = 0;
  /// As `CreateCurrentComponent`; `Scaled` says whether `Rect` is in the pixels per inch
  /// of the designer (true) or already in the parent's. A surface creates through it.
  virtual TComponent* CreateCurrentComponentScaled(TComponent* Parent, const TRect& Rect, bool Scaled) = 0;
  /// Where a new component would go now: the container of the one selected component, or
  /// the root.
  virtual TComponent* GetCurrentParent() = 0;
  /// The host's palette entry of `ComponentClass`, or null.
  virtual IPtr<IOTABasePaletteItem> GetPaletteItem(TClass ComponentClass) = 0;
  // State
  /// Puts `PropInfo` of `Instance` back to the ancestor's value and follows the ancestor
  /// again; nothing in a module without an ancestor.
  virtual void Revert(TPersistent* Instance, PPropInfo PropInfo) = 0;
  /// Runs the component editor of `Component` (the root's editor for the root); nothing
  /// when it has none.
  virtual void Edit(TComponent* Component) = 0;
  // Host paths and settings
  /// The host's executable path and base name.
  virtual String GetPathAndBaseExeName() = 0;
  /// The host's private directory.
  virtual String GetPrivateDirectory() = 0;
  /// The key under which the host keeps its settings.
  virtual String GetBaseRegKey() = 0;
};
/// Adds dormancy: a module can give up its live objects and come back.
struct FK_API IDesigner70 : IDesigner60 {
  FK_INTERFACE(IDesigner70, IDesigner60, "{6599235B-0ACF-58C5-A656-376B0D80AA56}")
  /// Whether the module is dormant: kept as a stream, without live components.
  virtual bool GetIsDormant() = 0;
  /// Brings a dormant module back from its stream; nothing for a live one.
  virtual void Resurrect() = 0;
};
/// Adds the inspector's modal edit and the application-data directory.
struct FK_API IDesigner80 : IDesigner70 {
  FK_INTERFACE(IDesigner80, IDesigner70, "{AB965C9A-2187-5203-A599-EA1FE63BA5E0}")
  /// Has the host start an in-place modal edit with key `EditKey`; `ReturnWindow` gets
  /// the focus back when it ends.
  virtual void ModalEdit(char EditKey, const IPtr<IActivatable>& ReturnWindow) = 0;
  /// Has the host select property `PropertyName` in the inspector.
  virtual void SelectItemName(const String& PropertyName) = 0;
  /// The host's application-data directory, local to the machine when `Local`.
  virtual String GetAppDataDirectory(bool Local) = 0;
};
/// Adds the file extension of the module's designer.
struct FK_API IDesigner100 : IDesigner80 {
  FK_INTERFACE(IDesigner100, IDesigner80, "{021D1089-8730-57B4-8BFF-60CE10C488A7}")
  /// The file extension of the modules of this module's designer, with its dot.
  virtual String GetDesignerExtension() = 0;
};
/// Adds the host's option store.
struct FK_API IDesigner170 : IDesigner100 {
  FK_INTERFACE(IDesigner170, IDesigner100, "{7882CC3A-580F-5DB1-9EAE-95FC1491C3AF}")
  /// The host's option store, counted; null when the host has none.
  virtual IPtr<IInterface> GetIDEOptions() = 0;
};
/// Adds the extent of what the surface shows.
struct FK_API IDesigner200 : IDesigner170 {
  FK_INTERFACE(IDesigner200, IDesigner170, "{DD881C5F-E35F-551D-A901-BE54E2DCB9D2}")
  /// The rectangle that holds `ScrollPosition` and every item of the surface: how far a
  /// design window must let the user scroll. Cost: all items.
  virtual TRect GetScrollRanges(const TPoint& ScrollPosition) = 0;
};
/// Adds the question whether a handler comes from the ancestor.
struct FK_API IDesigner290 : IDesigner200 {
  FK_INTERFACE(IDesigner290, IDesigner200, "{A92282B6-AC17-59F4-AE9F-F2D0AC8473B6}")
  /// Whether `Method` is a handler the module inherits: the parent of the root's class
  /// knows its code. False for a module without an ancestor.
  virtual bool MethodFromAncestor(const TMethod& Method) = 0;
};
/// The interface of a designed module: the newest of the chain.
struct FK_API IDesigner : IDesigner290 {
  FK_INTERFACE(IDesigner, IDesigner290, "{90FD7103-D315-50DE-86E9-ECC178430A84}")
  /// Whether the module's source may not be changed (the host's module record says so).
  virtual bool IsSourceReadOnly() = 0;
  /// The modifier keys and mouse buttons held now (the Ctrl key, the left button, ...), as
  /// the host's keyboard and mouse report them; empty when nothing is held.
  virtual TShiftState GetShiftState() = 0;
};

} // namespace formkit
