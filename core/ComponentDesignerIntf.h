//===- core/ComponentDesignerIntf.h - Designers, roots and the host ------===//
//
// The interfaces between the design core, the per-framework designers and the
// host: the collection of designers, one framework's designer, the module on
// design (`IRoot`, `IInternalRoot`), and the host's environment and module
// records, with the records and enumerations they pass.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "platform/Streams.h"

namespace formkit {

struct IRoot;
struct IInternalRoot;
struct IComponentDesigner;
struct IDesignerModule;

/// A stream of the host with the age of its content (-1 when no age is known).
struct FK_API IDatedStream : IStream {
  FK_INTERFACE(IDatedStream, IStream, "{69CD3924-F029-536A-9165-992E84486640}")
  /// The stamp of the module as of this stream.
  virtual int GetModifyTime() = 0;
  virtual void SetModifyTime(int Time) = 0;
};

/// Ties a root component to its ancestor and its descendants. The inheritance subsystem
/// implements it (a root gets one through `TRootHooks::CreateUpdateManager`); the core
/// asks it what the module's family looks like. The rest of its operations join with
/// that subsystem.
struct FK_API IUpdateManager : IInterface {
  FK_INTERFACE(IUpdateManager, IInterface, "{BE1E987D-8343-5DDB-BCF7-55D5397F2FBC}")
  /// Whether an open module inherits from this one at this moment: a descendant's manager
  /// has joined this one's family. While one does, a class that does not support
  /// inheritance may not be added here.
  virtual bool GetHasDescendents() = 0;
};

//===----------------------------------------------------------------------===//
// Records and enumerations
//===----------------------------------------------------------------------===//

/// The designer options the host keeps.
struct FK_API TDesignerOptions {
  bool DisplayGrid = true;
  bool SnapToGrid = true;
  bool ScaleGridSize = false;
  bool UseDesignerGuidelines = true;
  int GridSizeX = 8;
  int GridSizeY = 8;
  bool ShowComponentCaptions = false;
  bool ShowDesignerHints = true;
  bool LYTFormat = false;
  bool ShowNonVisualComponents = true;
  bool ShowExtendedControlHints = false;
};

/// What a module tells the host through `IDesignerModule::Notify`.
FK_ENUM(TNotifyCode, std::uint8_t, ncModuleDeleted, ncModuleRenamed, ncEditorModified, ncFormModified,
        ncEditorSelected, ncFormSelected, ncBeforeSave, ncAfterSave, ncFormSaving, ncProjResModified)
FK_ENUM(TDesignDialog, std::uint8_t, ddAlign, ddSize, ddScale, ddTabOrder, ddCreationOrder, ddSaveTemplate)
FK_ENUM(TDesignCommand, std::uint8_t, dmAlignToGrid, dmFlipAllChildren, dmFlipSelectedChildren, dmTextLYT,
        dmViewAsText, dmRevert, dmShowNonVisualComponents)

//===----------------------------------------------------------------------===//
// The host
//===----------------------------------------------------------------------===//

/// What the design core needs of the host. The host implements it once for the whole
/// environment and hands it to `InitializeDesigners`; each framework's designer keeps a
/// counted reference until the designer goes. Everything runs on the user-interface
/// thread. An exception raised here travels back through the core's cleanup to whoever
/// caused the call. Pointers the core passes in (designers, persistents) stay owned by
/// the core: the host may use them during the call and must not free them.
struct FK_API IDesignEnvironment : IInterface {
  FK_INTERFACE(IDesignEnvironment, IInterface, "{66C3291C-034A-5808-8FE1-9E52769E0AB3}")
  /// The active module of the active designer was modified. Called by the designer after
  /// each change of its active root, once `EvActiveRootModifiedEvent` went out; the host
  /// refreshes what shows the module.
  virtual void ActiveRootModified() = 0;
  /// A component or a root was renamed from `CurName` to `NewName`. Called at the end of a
  /// module's rename check, after the module record accepted the name and
  /// `EvComponentRenamedEvent` went out.
  virtual void ComponentRenamed(const String& CurName, const String& NewName) = 0;
  /// A component named `Name` of any open module, or null: the host's own finder of
  /// roots. A module's name lookup (`IDesigner::GetComponent`) does not ask it; that one
  /// finds the open modules through their designers. The component stays its own module's.
  virtual TComponent* FindGlobalComponent(const String& Name) = 0;
  /// Shows the dialog of a positioning command (align, size, scale, tab order, creation
  /// order, template) for the active module. Called when the user asks a module for that
  /// command's dialog; the dialog works on the module through `IDesigner`.
  virtual void Dialog(TDesignDialog Kind) = 0;
  /// Another root became the active designer's active root, or none is active now.
  /// Called by the designer's `RootActivated`, before `Designers` activates the designer.
  virtual void ActiveRootChanged() = 0;
  /// Brings the inspector forward. Nothing in the core calls it; it serves the host's
  /// own windows.
  virtual void ShowObjectInspector() = 0;
  /// The host's executable path and base name; forwarded unchanged by
  /// `IDesigner::GetPathAndBaseExeName`.
  virtual String GetPathAndBaseExeName() = 0;
  /// The host's private directory; forwarded by `IDesigner::GetPrivateDirectory`.
  virtual String GetPrivateDirectory() = 0;
  /// The application-data directory, local to the machine when `Local`; forwarded by
  /// `IDesigner::GetAppDataDirectory`.
  virtual String GetAppDataDirectory(bool Local) = 0;
  /// The host's version text. Nothing in the core calls it.
  virtual String GetIDEVersion() = 0;
  /// The key under which the host keeps its settings; forwarded by
  /// `IDesigner::GetBaseRegKey`.
  virtual String GetBaseRegKey() = 0;
  /// The host's option store, counted; forwarded by `IDesigner::GetIDEOptions`. Null when
  /// the host has none.
  virtual IPtr<IInterface> GetIDEOptions() = 0;
  /// Whether the host is busy. Nothing in the core calls it.
  virtual bool IsIDEBusy() = 0;
  /// Stores in `Item` the palette tool the user armed, or null when none is. Called when
  /// a tool is about to be used on a surface (`CreateCurrentComponent`, a create drag);
  /// the core makes the component through the item's `IInternalPaletteItem`, so an item
  /// without it creates nothing.
  virtual void GetToolSelected(IPtr<IOTABasePaletteItem>& Item) = 0;
  /// Stores in `Item` the palette entry of `ComponentClass`, or null. Called by
  /// `IDesigner::GetPaletteItem`.
  virtual void GetPaletteItem(TClass ComponentClass, IPtr<IOTABasePaletteItem>& Item) = 0;
  /// A number that never decreases: the modification stamp of modules. Called when a
  /// module is made, each time it is modified, and when it is saved.
  virtual int GetTimestamp() = 0;
  /// Fills `Options` with the designer options (grid, snapping, guidelines, captions,
  /// hints, text form). Called whenever a module applies its options (`UpdateOptions`,
  /// at open and after `DesignerOptionsChanged`) and when a component is dropped at a
  /// point. `Options` comes in with the defaults.
  virtual void GetDesignerOptions(TDesignerOptions& Options) = 0;
  /// Fills `Rect` with the main window's rectangle; design windows use its bottom edge to
  /// place themselves below it.
  virtual void GetMainWindowSize(TRect& Rect) = 0;
  /// Brings the palette forward. Nothing in the core calls it.
  virtual void ShowPalette() = 0;
  /// Brings the structure view forward. Nothing in the core calls it.
  virtual void ShowStructureView() = 0;
  /// Refreshes the inspector. Nothing in the core calls it.
  virtual void RefreshInspector() = 0;
  /// A class named `Name` that no registry knows but the host can still supply, or null.
  /// Called while a module is read, when the reader meets an unknown class. A class the
  /// host returns must stay alive as long as modules use it.
  virtual TClass FindComponentClass(const String& Name) = 0;
  /// Gives the host the chance to load the package of class `Name` before `Designer`
  /// searches its custom-module registrations for it (`FindCustomModuleClass`). May do
  /// nothing.
  virtual void EnsureClassAvailable(const String& Name, const IPtr<IComponentDesigner>& Designer) = 0;
  /// Starts an in-place modal edit of the inspector with the key `EditKey`; when it ends
  /// the host activates `ReturnWindow` (through the designer's `ModalEditDone`). Forwarded
  /// by `IDesigner::ModalEdit`.
  virtual void ModalEdit(char EditKey, const IPtr<IActivatable>& ReturnWindow) = 0;
  /// Opens the module named `Name` (a root name, without the class's leading "T") so that
  /// it becomes a root of its designer; `Project` is null. Called when a module needs
  /// another one that is not open (an ancestor, a nested frame's module). Opening nothing
  /// is allowed: the caller then goes on without it.
  virtual void OpenModuleByName(const String& Name, const IPtr<IInterface>& Project) = 0;
  /// The armed palette tool has been used: the host disarms it. Called after every
  /// creation from the armed tool, also when the creation failed.
  virtual void ToolUsed() = 0;
  /// The selection of the active designer or the active root changed. Called by the
  /// designer's `SetSelection` when either changed, and when `Designers` activates another
  /// designer; the host refreshes the inspector from `Designers()->GetSelection`.
  virtual void SelectionChanged() = 0;
  /// Selects the property `Name` in the inspector. Forwarded by
  /// `IDesigner::SelectItemName`.
  virtual void SelectItemName(const String& Name) = 0;
  /// Refreshes the palette. Nothing in the core calls it.
  virtual void RefreshPalette() = 0;
  /// Whether a module's save keeps a backup of the previous file.
  virtual bool GetCreateBackups() = 0;
  /// The name of the current desktop. Nothing in the core calls it.
  virtual String GetDesktopName() = 0;
  /// `Item` of the module behind `ADesigner` is about to go (deleted by the user or
  /// removed from the module). Called before the design notification listeners hear of
  /// it; `Item` is still alive during the call and must not be kept.
  virtual void ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* Item) = 0;
  /// The modifier keys and mouse buttons held now, as the host's keyboard and mouse
  /// report them (`ssCtrl`, `ssLeft`, ...). Called by `IDesigner::GetShiftState`, for
  /// an editor that acts differently on a Ctrl-click.
  virtual TShiftState GetShiftState() = 0;
};

/// The events of one object (a component, a sub-object, a collection item) as the host's
/// source editing needs them, without type information: the names and handlers of its
/// event properties, sorted by name, and the objects below it that have events too. The
/// core makes one (`TCompInfo`) for each call that hands it to the host; the host may keep
/// it for the call only, since the object it describes belongs to the module.
///
/// Example (the host, renaming a component's handlers with it):
///   for (int I = 0; I < Info->GetEventCount(); ++I)
///     if (String Handler = Info->GetEventValue(I); !Handler.empty()) Rename(Handler);
struct FK_API ICompInfo : IInterface {
  FK_INTERFACE(ICompInfo, IInterface, "{E1065483-5709-4C88-8011-F38B70DD1FAA}")
  /// Clears event `Index`: back to the ancestor's handler when the module can revert it,
  /// else unassigned; the module is then modified. Raises `EListError` for a bad index.
  virtual void ClearEvent(int Index) = 0;
  /// The class name of the object ("TForm1", "TButton").
  virtual String GetClassName() = 0;
  /// The class name with its unit ("Unit1.TForm1").
  virtual String GetQualifiedClassName() = 0;
  /// The number of event properties.
  virtual int GetEventCount() = 0;
  /// The property of event `Index`. Raises `EListError` for a bad index.
  virtual PPropInfo GetEventInfo(int Index) = 0;
  /// The signature of event `Index`, new at each call.
  virtual IPtr<IEventInfo> GetIEventInfo(int Index) = 0;
  /// The name of event `Index` ("OnClick").
  virtual String GetEventName(int Index) = 0;
  /// The name of the handler event `Index` holds when it is a method of the module;
  /// empty when it holds nothing or a method of something else.
  virtual String GetEventValue(int Index) = 0;
  /// The object as a design object, new at each call.
  virtual IPtr<IDesignObject> GetComponentHandle() = 0;
  /// The object's name path ("Button1", "Form1.Button1.Font").
  virtual String GetNamePath() = 0;
  /// The number of objects below: the sub-objects, then a collection's items.
  virtual int GetSubInfoCount() = 0;
  /// The description of object `Index` below; null when that sub-object property holds
  /// nothing. Raises `EListError` for a bad index.
  virtual IPtr<ICompInfo> GetSubInfo(int Index) = 0;
};

/// The host's record of one open module: its source, its file, its place in the project.
/// The host makes one per open module and gives it to the designer's `CreateRoot`; the
/// root keeps a counted reference until the root itself goes. It must also answer to
/// `IOTAModule` (the module's file names) and may answer to `IDesignerViewModule` and
/// `IDesignerLoadingFormModified`. Callbacks and lists passed in belong to the caller and
/// live only for the call. Operations that may refuse do so by raising; the core then
/// leaves the module as it was.
struct FK_API IDesignerModule : IInterface {
  FK_INTERFACE(IDesignerModule, IInterface, "{CEA12DE6-B18A-5AA0-A083-411F21A292F8}")
  /// Brings the module's editor forward. Nothing in the core calls it.
  virtual void Activate(bool IsVisual) = 0;
  /// Adds a method `Name` of the signature `EventInfo` to the source. Called by
  /// `IDesigner::CreateMethod`, after `CheckWritable`; the core then binds the method of
  /// the designed class.
  virtual void CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) = 0;
  /// The module is dirty. Called first by every change of the module (the root's
  /// `Modified`), followed by `Notify(ncFormModified)`.
  virtual void Modified() = 0;
  /// A text that tells this module apart, appended to the root class's qualified name by
  /// `IComponentDesigners::GetCustomModuleIdentifier`; may be empty.
  virtual String GetModuleIdentifier() = 0;
  /// The unit of the module's component. Nothing in the core calls it.
  virtual String GetCompUnitName() = 0;
  /// The ancestor class that the source declares for the form class `ClassName`. Called
  /// when a module is made from its file, to find the module it inherits from.
  virtual String GetAncestorClassName(const String& ClassName) = 0;
  /// Calls `Proc` with the name of each method of the source whose signature fits
  /// `EventInfo`. Called by `IDesigner::GetMethods`, for an event's value list.
  virtual void GetMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) = 0;
  /// The same for the methods that the ancestors' sources declare. Nothing in the core
  /// calls it.
  virtual void GetAncestorMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) = 0;
  /// Whether method `Name` comes from an ancestor. Nothing in the core calls it.
  virtual bool IsMethodInherited(const String& Name) = 0;
  /// Shows the module's source. Nothing in the core calls it.
  virtual void ShowSource() = 0;
  /// A dormant module came back to life: its root component exists again.
  virtual void ModuleResurrected() = 0;
  /// Whether the source has a method `Name`; of the signature `EventInfo`, or of any
  /// signature when it is null. Called by `IDesigner::MethodExists`.
  virtual bool MethodExists(const String& Name, const IPtr<IEventInfo>& EventInfo) = 0;
  /// A component the module owns, described by `Info`, is renamed from `CurName` to
  /// `NewName` (empty when it loses its name): the host renames it in the source, or
  /// raises to refuse. Called by the root's rename check; not for components that come
  /// from an ancestor, nor while an ancestor's update renames them.
  virtual void RenameComponent(const IPtr<ICompInfo>& Info, const String& CurName, const String& NewName) = 0;
  /// The root component described by `Info` is to be called `NewName`: the host checks
  /// the name against the project and the source, and raises to refuse. Called by the
  /// root's rename check before the root is renamed.
  virtual void ValidateComponentName(const IPtr<ICompInfo>& Info, const String& NewName) = 0;
  /// Renames method `CurName` of the source to `NewName`. Called by
  /// `IDesigner::RenameMethod`.
  virtual void RenameMethod(const String& CurName, const String& NewName) = 0;
  /// Shows method `Name` in the code editor. Called by `IDesigner::ShowMethod`.
  virtual void ShowMethod(const String& Name) = 0;
  /// Calls `Proc` with the names of the units this module may import and of the roots it
  /// may link to. Called when a module lists the components it may refer to.
  virtual void GetComponentNames(const TGetStrProc& Proc) = 0;
  /// Adds to the source the reference to the module of root `RootName`, so that this
  /// module may refer to its components. Called by `IDesigner::MakeComponentLinkable`.
  virtual void MakeComponentLinkable(const String& RootName) = 0;
  /// The module's stream is about to be written. Called before each save of the module.
  virtual void BeforeSave() = 0;
  /// Tells the host what happened to the module: `ncFormModified` after each change,
  /// `ncFormSaving` before the stream is written.
  virtual void Notify(TNotifyCode Code) = 0;
  /// Swaps the module to its text form in the code editor. Called when the user asks to
  /// see the module as text.
  virtual void ViewAsText() = 0;
  /// The source text of method `Name`, which goes with copied components.
  virtual String GetMethodSource(const String& Name) = 0;
  /// Adds pasted method bodies `Text` to the source, with the method renames that the
  /// paste made (`Renames`, lines "old=new"). The host adds to `Inserted` the name of each
  /// method it inserted. Both lists are the caller's.
  virtual void InsertMethodSource(const String& Text, TStrings* Renames, TStrings* Inserted) = 0;
  /// Calls `Proc` with the host's information on each module of the project. Called by
  /// `IDesigner::GetProjectModules`.
  virtual void GetProjectModules(const TGetModuleProc& Proc) = 0;
  /// Whether the source may not be changed. Asked before changes
  /// (`IDesigner::IsSourceReadOnly`, a module's check before it changes anything); a
  /// read-only module refuses them with "Source is read-only".
  virtual bool GetReadOnly() = 0;
  /// The unit of the module: the unit name of its generated class and what a written
  /// module names as its unit.
  virtual String GetUnitName() = 0;
  /// Inserts into handler `MethodName` a call to handler `InstanceMethod` of component
  /// `InstanceName`, of the signature `EventInfo`. Called by `IDesigner::ChainCall`.
  virtual void ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                         const IPtr<IEventInfo>& EventInfo) = 0;
  /// Saves the module. Nothing in the core calls it.
  virtual void Save() = 0;
  /// The module's file name. Nothing in the core calls it: the root keeps its own.
  virtual String GetFileName() = 0;
  /// The host's last word before any change of the module (a new component, a new
  /// method, a deletion, a modification check): it refuses by raising, and the core then
  /// has changed nothing.
  virtual void CheckWritable() = 0;
  /// Closes the module. Nothing in the core calls it.
  virtual void Close() = 0;
};

/// A module record that also keeps the views of a module: its view list, lines
/// "Name=Value" in the order of the module's views, where Value is the device attribute
/// of the view's device or a single blank when there is none. A module whose record does
/// not answer to this interface has no views.
struct FK_API IDesignerViewModule : IDesignerModule {
  FK_INTERFACE(IDesignerViewModule, IDesignerModule, "{AEF995C4-E519-547D-838B-2CD5717CCBE5}")
  /// Fills `Strings` (the caller's) with the module's view list, replacing what it held.
  virtual void GetViewNames(TStrings* Strings) = 0;
  /// Keeps the lines of `Strings` (the caller's) as the module's view list.
  virtual void SetViewNames(TStrings* Strings) = 0;
  /// The name of the device attribute whose value a new view's line takes.
  virtual void GetDeviceAttributeName(String& Name) = 0;
};

/// The form changed while it was being loaded: the host treats it as modified.
struct FK_API IDesignerLoadingFormModified : IInterface {
  FK_INTERFACE(IDesignerLoadingFormModified, IInterface, "{0004BE68-5130-57F8-A1A7-CCA8D793A6DA}")
  virtual void LoadingFormModified() = 0;
};

//===----------------------------------------------------------------------===//
// The module on design
//===----------------------------------------------------------------------===//

/// The file side of a module on design. The core implements it (a module on design is
/// one); the host calls it.
struct FK_API IFile : IInterface {
  FK_INTERFACE(IFile, IInterface, "{319FC3B9-0745-5612-A3E8-AA2981A1E2C0}")
  /// Whether the file still is what the module was loaded from; true when nothing says
  /// otherwise.
  virtual bool CheckFileDate() = 0;
  /// The module's stream, to read, without a copy where it can be helped: the module's
  /// cached image is lent and comes back when the stream goes, unless the module changed
  /// in between. A dormant module gives a copy. Null for a closed module.
  virtual IPtr<IDatedStream> FormFileOpen() = 0;
  /// The module's file name, as given when it was made or last renamed.
  virtual String GetFileName() = 0;
  /// The modification stamp: the host's `GetTimestamp` at the last change, the file's
  /// age before any change.
  virtual int GetModifyTime() = 0;
  /// The file's age at the last load or save (-1 when unknown).
  virtual int GetTimeAtLoad() = 0;
  /// The module's file is now `NewFileName`, with the module's own extension kept. The
  /// file itself is the host's to move.
  virtual void Rename(const String& NewFileName) = 0;
  /// Writes the module to its file, with a backup when the host asks for one. Raises
  /// `EComponentDesignerException` when the module cannot be written; the file and the
  /// module then stay as they were.
  virtual void Save() = 0;
};

/// A module on design, as the host and the designers see it. The core implements it; the
/// framework's designer makes one with `CreateRoot` and keeps it in its list, and that
/// counted reference keeps it alive. The host holds its own references while the module
/// is open and drops them after `Close`. Components and designers it hands out stay the
/// module's: the host must not free them.
struct FK_API IRoot : IFile {
  FK_INTERFACE(IRoot, IFile, "{6B87AE67-CD56-516C-A934-3931FB915661}")
  /// Closes the module: its views first, then it leaves its designer's list, listeners
  /// hear `DesignerClosed`, and the surface and the root component are freed. The object
  /// lives on until its last reference goes; nothing but the plain reads works on it.
  virtual void Close() = 0;
  /// The host's record that the module was made with.
  virtual IPtr<IDesignerModule> GetModule() = 0;
  /// The root component, owned by the module; null while the module is dormant or closed.
  virtual TComponent* GetRoot() = 0;
  /// The root component's name; while dormant or closed, the name it had.
  virtual String GetRootName() = 0;
  /// Hides the design window (a master with an active view hides that view's).
  virtual void Hide() = 0;
  /// Gives up the live components and the surface, keeping the module as a stream, to
  /// come back with `Resurrect`. Raises `EComponentDesignerException` when dormancy is
  /// not available.
  virtual void GoDormant() = 0;
  /// Shows the design window (a view makes itself its master's active view first).
  virtual void Show() = 0;
  /// Shows the help of the selected component's class, or the designer's help.
  virtual void ShowHelp() = 0;
  /// The module as editors see it.
  virtual IPtr<IDesigner> GetDesigner() = 0;
  /// The view shown now: this module when it has no view active.
  virtual IPtr<IRoot> GetActiveView() = 0;
  /// The number of views of this master module; 0 without views.
  virtual int GetViewCount() = 0;
  /// View `Index`; raises `EListError` for a bad index.
  virtual IPtr<IRoot> GetView(int Index) = 0;
  /// The name of view `Index`; raises `EListError` for a bad index.
  virtual String GetViewName(int Index) = 0;
  /// The index of the view named `Name`, or -1.
  virtual int GetViewIndex(const String& Name) = 0;
  /// The master module of a view; null for a master.
  virtual IPtr<IRoot> GetMasterView() = 0;
  /// Adds a view named `Name` and gives its index.
  virtual int AddView(const String& Name) = 0;
  /// Draws the module as it looks now into `Bitmap`, which stays the caller's.
  virtual void GetViewPreview(TPersistent* Bitmap) = 0;
  /// Draws the view `ViewName` into `Bitmap`, which stays the caller's.
  virtual void GetViewPreview(const String& ViewName, TPersistent* Bitmap) = 0;
  /// Removes the view named `Name`; nothing when there is none.
  virtual void RemoveView(const String& Name) = 0;
  /// Removes view `Index`; raises `EListError` for a bad index.
  virtual void RemoveView(int Index) = 0;
};

/// What the designers need of a module on design beyond `IRoot`. The core implements it
/// and calls it; a host has no need to, but may.
struct FK_API IInternalRoot : IRoot {
  FK_INTERFACE(IInternalRoot, IRoot, "{9CBCCDAE-D53F-5747-8B8F-07DDBABF2CA6}")
  /// The design window hides with the host's windows (`HideWindows`).
  virtual void HideForModule() = 0;
  /// The design window shows again with the host's windows (`ShowWindows`).
  virtual void ShowForModule() = 0;
  /// The class of the module's custom module; null when none is registered.
  virtual TClass GetCustomModuleClass() = 0;
  /// The framework base class the module's root descends from (a form, a frame, a data
  /// module).
  virtual TClass GetRootBaseClass() = 0;
  /// The registered root class of the module. When no registration of its designer has
  /// it, raises `EComponentDesignerException` "Root class not found: "%s"".
  virtual TClass GetRootClass() = 0;
  /// The module's custom module; null when none.
  virtual IPtr<ICustomModule> GetCustomModule() = 0;
  /// The update manager that ties the module to its ancestor and descendants; null
  /// without inheritance support.
  virtual IPtr<IUpdateManager> GetUpdateManager() = 0;
  /// The object behind the interface, for code that must reach the concrete root.
  virtual TObject* Implementor() = 0;
  /// Whether the module is dormant: kept as a stream, without live components.
  virtual bool IsDormant() = 0;
  /// Tells the module's update managers that it changed, so that its descendants follow.
  virtual void ModifiedUpdateNotification() = 0;
  /// Pastes the components in `Stream` under `Parent` (null: the current parent) at
  /// `Rect`. The designer forwards its paste to its active module's master. The stream
  /// stays the caller's.
  virtual void PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) = 0;
  /// `Component` of another module is about to go: the module drops its references to it.
  virtual void RemoveDependenciesOn(TComponent* Component) = 0;
  /// Brings a dormant module back from its stream; nothing for a live one.
  virtual void Resurrect() = 0;
  /// The module becomes (true) or stops being (false) the active one of its designer: its
  /// grab handles turn active unless the controls are locked.
  virtual void SetActive(bool Value) = 0;
  /// Locks (true) or unlocks the controls of the surface against moving and sizing.
  virtual void SetControlsLocked(bool Value) = 0;
  /// Works out again which modules this one refers to, after a rename.
  virtual void UpdateDependencies() = 0;
  /// Applies the host's designer options again (grid, snapping, guidelines, captions).
  virtual void UpdateOptions() = 0;
  /// Makes `View` the view a master shows.
  virtual void SetActiveView(const IPtr<IRoot>& View) = 0;
  /// The module this one inherits from; null without an ancestor.
  virtual IPtr<IRoot> GetAncestorRoot() = 0;
  /// Adds the current selection to `List`, in order.
  virtual void GetSelections(const IPtr<IDesignerSelections>& List) = 0;
  /// Ends whatever the mouse is doing on the surface (a drag, a rubber band).
  virtual void CancelModes() = 0;
  /// Writes the selected components to `Stream`, which stays the caller's.
  virtual void CopySelectionToStream(TStream* Stream) = 0;
  /// Whether the module is a view of another module.
  virtual bool IsView() = 0;
  /// Help for member `Member` of the selection: keyword, file and type (0 keyword, 1
  /// context); false when the module has none.
  virtual bool SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) = 0;
};

//===----------------------------------------------------------------------===//
// Designers
//===----------------------------------------------------------------------===//

/// Makes roots; the base of one framework's designer.
struct FK_API IBaseComponentDesigner : IInterface {
  FK_INTERFACE(IBaseComponentDesigner, IInterface, "{3E66F6F8-39F1-5862-AF6E-227BECFCCB03}")
  virtual IPtr<IRoot> CreateRoot(const IPtr<IDesignerModule>& Module, const String& FileName, bool AExisting,
                                 const String& AFormName, const String& AAncestorName, const String& AFileSystem,
                                 const IPtr<IRoot>& AAncestorRoot, const String& AViewName) = 0;
  virtual IPtr<IRoot> CreateRootFromStream(const IPtr<IDesignerModule>& Module, const String& FileName,
                                           const String& AFileSystem, const IPtr<IDatedStream>& AStream,
                                           const IPtr<IRoot>& AAncestorRoot, const String& AViewName) = 0;
  virtual String GetDesignerName() = 0;
  /// The file extension of the designer's modules, with its dot.
  virtual String GetDesignerExtension() = 0;
};

/// One framework's designer as the host and `Designers` see it.
struct FK_API IComponentDesigner : IBaseComponentDesigner {
  FK_INTERFACE(IComponentDesigner, IBaseComponentDesigner, "{B4310E1E-796A-50A2-9930-C6A28B336034}")
  virtual bool GetActive() = 0;
  virtual void DesignerOptionsChanged() = 0;
  virtual bool FindFile(const String& Name, IPtr<IRoot>& Root) = 0;
  virtual IPtr<IRoot> FindRoot(TComponent* Component) = 0;
  virtual IPtr<IRoot> FindRoot(const String& Name) = 0;
  virtual IPtr<IRoot> GetActiveRoot() = 0;
  virtual String GetFirstSelectionType() = 0;
  virtual String GetFirstSelectionUnit() = 0;
  virtual void GetProperties(const TGetPropProc& Proc) = 0;
  virtual void HideWindows() = 0;
  virtual void ShowWindows() = 0;
  virtual IPtr<IRoot> OpenRootClass(const String& ClassName) = 0;
  virtual void GetSelection(const IPtr<IDesignerSelections>& List) = 0;
  virtual void SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                            const IPtr<IDesignerSelections>& Selections) = 0;
  /// The plain module class of the framework.
  virtual TClass GetDataModuleClass() = 0;
  virtual bool GetControlsLocked() = 0;
  virtual void SetControlsLocked(bool Value) = 0;
  /// Raises the list's error for a bad index.
  virtual IPtr<IRoot> GetRoots(int Index) = 0;
  virtual int GetRootsCount() = 0;
  virtual IPtr<IDesignEnvironment> GetEnvironment() = 0;
  virtual void CancelModes() = 0;
  virtual void CopySelectionToStream(TStream* Stream) = 0;
  virtual void PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) = 0;
  virtual bool EditAction(TEditAction Action) = 0;
  virtual TEditState GetEditState() = 0;
  virtual void GetClassUnits(const String& ClassName, const TGetStrProc& Proc) = 0;
  virtual TClass GetFirstSelectionClass() = 0;
  virtual void GetRootNames(const TGetStrProc& Proc) = 0;
  virtual String GetSelectionName() = 0;
  virtual String GetSelectionType() = 0;
  virtual bool IsNestable(const String& ClassName) = 0;
  virtual void ModalEditDone(const IPtr<IActivatable>& ReturnWindow) = 0;
  virtual void RootActivated(const IPtr<IRoot>& Root) = 0;
};

/// What a root tells its designer of its place in the designer's list.
struct FK_API IRootListUpdate : IInterface {
  FK_INTERFACE(IRootListUpdate, IInterface, "{7E54AB5C-DB93-5335-B644-D145495ECDBE}")
  virtual void RootListAdd(const IPtr<IRoot>& Root) = 0;
  virtual void RootListRemove(const IPtr<IRoot>& Root) = 0;
  virtual void RootGoingDormant(const IPtr<IRoot>& Root) = 0;
  virtual void RootModified(const IPtr<IRoot>& Root) = 0;
};

/// What the core needs of a framework's designer beyond `IComponentDesigner`.
struct FK_API IInternalComponentDesigner : IComponentDesigner {
  FK_INTERFACE(IInternalComponentDesigner, IComponentDesigner, "{5E1CF33F-1D02-565D-9E0C-3619BAE9401C}")
  virtual void RemoveDependenciesOn(TComponent* Component) = 0;
  virtual void RootListAdd(const IPtr<IRoot>& Root) = 0;
  virtual void RootListRemove(const IPtr<IRoot>& Root) = 0;
  virtual void RootGoingDormant(const IPtr<IRoot>& Root) = 0;
  virtual void RootModified(const IPtr<IRoot>& Root) = 0;
  virtual void UpdateRootDependents() = 0;
  virtual void UpdateSelections() = 0;
  // File operations, each with the file system's name first.
  /// A stream of the file; `Mode` is `fmOpenRead | fmShareDenyNone` (64) to read or
  /// `fmCreate` (65280) to write. The caller owns it.
  virtual TStream* OpenFile(const String& FileSystem, const String& Name, int Mode) = 0;
  /// The file's age; -1 when unknown.
  virtual int GetFileAge(const String& FileSystem, const String& Name) = 0;
  virtual bool FileExists(const String& FileSystem, const String& Name) = 0;
  virtual bool RenameFile(const String& FileSystem, const String& OldName, const String& NewName) = 0;
  virtual void GetTempFileName(const String& FileSystem, const String& Name, String& TempName) = 0;
  virtual void GetBackupFileName(const String& FileSystem, const String& Name, String& BackupName) = 0;
  virtual bool IsFileReadOnly(const String& FileSystem, const String& Name) = 0;
  virtual bool DeleteFile(const String& FileSystem, const String& Name) = 0;
  /// After a successful write to a file that existed.
  virtual void FileWritten(const String& FileSystem, TStream* Stream) = 0;
  virtual String FindBaseClass(const String& ClassName) = 0;
  virtual TClass FindCustomModuleClass(const String& ClassName) = 0;
  virtual bool IsRootBaseClass(const String& ClassName) = 0;
  virtual bool SupportsRootClass(TClass RootClass) = 0;
};

/// Marks a designer as registered with `Designers`.
struct FK_API IDesignerRegistrationInterface : IInterface {
  FK_INTERFACE(IDesignerRegistrationInterface, IInterface, "{4FACCD1B-A0E3-5E61-AB24-3BB0DCD9E05B}")
};

/// Called by `ForEachDesigner`; false stops the walk.
using TDesignerIterFunc = std::function<bool(const IPtr<IComponentDesigner>& Designer)>;

/// The one collection of designers: the host's entry point to all frameworks at once.
/// The core implements it (`Designers()`, while the core runs); the host calls it. It
/// holds each registered designer and the active one by counted references; what it
/// hands out stays the designers'.
struct FK_API IComponentDesigners : IInterface {
  FK_INTERFACE(IComponentDesigners, IInterface, "{8BC8F32B-4444-53DD-A40D-624670621E1F}")
  /// Whether any designer has an active module; asked in registration order.
  virtual bool DesignerActive() = 0;
  /// The host's designer options changed: every designer has each of its modules apply
  /// them again.
  virtual void DesignerOptionsChanged() = 0;
  /// Finds the open module of file `Name` (file names compared as the platform does),
  /// asking the designers in order; true with the module in `Root`, or false with `Root`
  /// null.
  virtual bool FindFile(const String& Name, IPtr<IRoot>& Root) = 0;
  /// The active designer, or null.
  virtual IPtr<IComponentDesigner> GetActiveDesigner() = 0;
  /// Hides every designer's design windows and the design windows that listen, as the
  /// host hides its own windows.
  virtual void HideWindows() = 0;
  /// Shows them again.
  virtual void ShowWindows() = 0;
  /// The project's name changed. Does nothing.
  virtual void SetProjectName(const String& Name) = 0;
  /// Locks (true) or unlocks the controls of every module of every designer.
  virtual void SetControlsLocked(bool Value) = 0;
  /// Whether the active designer's controls are locked; false without an active designer.
  virtual bool GetControlsLocked() = 0;
  /// The active module as an alignment target, or null.
  virtual IPtr<IOTAAlignable> GetAlignable() = 0;
  /// Adds the active designer's selection to `List`; nothing without an active designer.
  virtual void GetSelection(const IPtr<IDesignerSelections>& List) = 0;
  /// Sets the active designer's selection: `Selections` of the module `Designer`, set by
  /// `Window` (its `IEditHandler` then gets the edit commands). Nothing without an active
  /// designer. The list is copied, not kept.
  virtual void SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                            const IPtr<IDesignerSelections>& Selections) = 0;
  /// Shows the help of the active module's selection; nothing without one.
  virtual void ShowComponentHelp() = 0;
  /// Help for member `Member` of the active module's selection. Clears both strings
  /// first; false without an active module. The help type out-value: 0 keyword, 1 context.
  virtual bool SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) = 0;
  /// Hands the editors of the selection's common properties to `Proc`, for the
  /// inspector; nothing without an active designer or with an empty selection.
  virtual void GetProperties(const TGetPropProc& Proc) = 0;
  /// The class name of the first selected object; empty without one.
  virtual String GetFirstSelectionType() = 0;
  /// The unit name of the first selected object's class; empty without one.
  virtual String GetFirstSelectionUnit() = 0;
  /// The file extension of each designer's modules, in registration order.
  virtual std::vector<String> RegisteredExtensions() = 0;
  /// The plain module class of each designer, in registration order.
  virtual std::vector<TClass> InvalidDataModuleClasses() = 0;
  /// The designer whose modules have extension `Ext` (letter case ignored), or null.
  virtual IPtr<IComponentDesigner> DesignerFromExtension(const String& Ext) = 0;
  /// Whether a custom module is registered for exactly `ComponentClass` as a root class.
  virtual bool RootComponentClass(TClass ComponentClass) = 0;
  /// Names the module behind `CustomModule`: the qualified class name of its root, then a
  /// point and the module record's `GetModuleIdentifier` when that is not empty. Empty
  /// when no open module has that custom module.
  virtual String GetCustomModuleIdentifier(const IPtr<ICustomModule>& CustomModule) = 0;
  /// A surface outside the core took the focus: no designer is active any more.
  /// `EvDesignerDeactivated` goes out when one was.
  virtual void DesignerDeactivated() = 0;
  /// Calls `Func` for each designer in registration order until it returns false. Works
  /// on a copy of the list, so `Func` may register or unregister designers.
  virtual void ForEachDesigner(const TDesignerIterFunc& Func) = 0;
};

/// What designers and modules tell the collection. The core calls it: a framework's
/// designer package registers its designer from its initializer, and the host
/// unregisters it before the core stops.
struct FK_API IInternalComponentDesigners : IComponentDesigners {
  FK_INTERFACE(IInternalComponentDesigners, IComponentDesigners, "{63D7E0FE-EC71-5085-A84F-096C2D10A180}")
  /// Adds `Designer` with its file extension and plain module class; it becomes the
  /// active designer when none is. The collection keeps a counted reference.
  virtual void RegisterDesigner(const IPtr<IComponentDesigner>& Designer) = 0;
  /// Removes `Designer` and drops the reference; when it was active, no designer is.
  /// Close its modules first.
  virtual void UnregisterDesigner(const IPtr<IComponentDesigner>& Designer) = 0;
  /// Makes `Designer` and its active module the active ones. Called when a module is made
  /// and when a module is activated. When either changed, the root-activated handlers
  /// hear of it; when the designer changed, the host's `SelectionChanged` runs.
  virtual void ActivateDesigner(const IPtr<IComponentDesigner>& Designer) = 0;
  /// `Root` left its designer: forgotten as the active module.
  virtual void RootRemoved(const IPtr<IRoot>& Root) = 0;
};

} // namespace formkit
