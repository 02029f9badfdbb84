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
  virtual int GetModifyTime() = 0;
};

/// Ties a root component to its ancestor and its descendants; its operations join with
/// the inheritance subsystem.
struct FK_API IUpdateManager : IInterface {
  FK_INTERFACE(IUpdateManager, IInterface, "{BE1E987D-8343-5DDB-BCF7-55D5397F2FBC}")
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

/// What the design core needs of the host; one instance for the whole environment.
struct FK_API IDesignEnvironment : IInterface {
  FK_INTERFACE(IDesignEnvironment, IInterface, "{66C3291C-034A-5808-8FE1-9E52769E0AB3}")
  virtual void ActiveRootModified() = 0;
  virtual void ComponentRenamed(const String& CurName, const String& NewName) = 0;
  /// A component of any open module, or null.
  virtual TComponent* FindGlobalComponent(const String& Name) = 0;
  virtual void Dialog(TDesignDialog Kind) = 0;
  virtual void ActiveRootChanged() = 0;
  virtual void ShowObjectInspector() = 0;
  virtual String GetPathAndBaseExeName() = 0;
  virtual String GetPrivateDirectory() = 0;
  virtual String GetAppDataDirectory(bool Local) = 0;
  virtual String GetIDEVersion() = 0;
  virtual String GetBaseRegKey() = 0;
  /// The host's option store.
  virtual IPtr<IInterface> GetIDEOptions() = 0;
  virtual bool IsIDEBusy() = 0;
  /// The palette item the user picked; null when none.
  virtual void GetToolSelected(IPtr<IOTABasePaletteItem>& Item) = 0;
  virtual void GetPaletteItem(TClass ComponentClass, IPtr<IOTABasePaletteItem>& Item) = 0;
  /// A number that grows: the modification stamp of modules.
  virtual int GetTimestamp() = 0;
  virtual void GetDesignerOptions(TDesignerOptions& Options) = 0;
  /// The main window's rectangle; callers use its bottom edge.
  virtual void GetMainWindowSize(TRect& Rect) = 0;
  virtual void ShowPalette() = 0;
  virtual void ShowStructureView() = 0;
  virtual void RefreshInspector() = 0;
  /// A class the host can still supply, or null.
  virtual TClass FindComponentClass(const String& Name) = 0;
  /// May make the class available before the registrations are searched.
  virtual void EnsureClassAvailable(const String& Name, const IPtr<IComponentDesigner>& Designer) = 0;
  virtual void ModalEdit(char EditKey, const IPtr<IActivatable>& ReturnWindow) = 0;
  /// Opens the module with that name so that it becomes a root.
  virtual void OpenModuleByName(const String& Name, const IPtr<IInterface>& Project) = 0;
  /// The picked palette tool has been used.
  virtual void ToolUsed() = 0;
  /// The selection on the active designer changed.
  virtual void SelectionChanged() = 0;
  virtual void SelectItemName(const String& Name) = 0;
  virtual void RefreshPalette() = 0;
  /// Whether a backup of the previous file is kept when a module is saved.
  virtual bool GetCreateBackups() = 0;
  virtual String GetDesktopName() = 0;
  /// An object is about to go.
  virtual void ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* Item) = 0;
};

/// A component's identity as the host's source editing needs it.
struct FK_API TCompInfo {
  String Name;
  String ClassName;
  String UnitName;
};

/// The host's record of one open module. It also answers to `IOTAModule`.
struct FK_API IDesignerModule : IInterface {
  FK_INTERFACE(IDesignerModule, IInterface, "{CEA12DE6-B18A-5AA0-A083-411F21A292F8}")
  virtual void Activate(bool IsVisual) = 0;
  /// Adds a method to the source.
  virtual void CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) = 0;
  /// The module is dirty.
  virtual void Modified() = 0;
  /// A string the host gives; may be empty.
  virtual String GetModuleIdentifier() = 0;
  virtual String GetCompUnitName() = 0;
  /// The ancestor class the source declares for a form class.
  virtual String GetAncestorClassName(const String& ClassName) = 0;
  /// Enumerates the source's methods that fit `EventInfo`.
  virtual void GetMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) = 0;
  virtual void GetAncestorMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) = 0;
  virtual bool IsMethodInherited(const String& Name) = 0;
  virtual void ShowSource() = 0;
  /// A dormant root came back.
  virtual void ModuleResurrected() = 0;
  virtual bool MethodExists(const String& Name, const IPtr<IEventInfo>& EventInfo) = 0;
  virtual void RenameComponent(const TCompInfo& Info, const String& CurName, const String& NewName) = 0;
  virtual void ValidateComponentName(const TCompInfo& Info, const String& NewName) = 0;
  virtual void RenameMethod(const String& CurName, const String& NewName) = 0;
  virtual void ShowMethod(const String& Name) = 0;
  /// The importable units and the roots this module links to.
  virtual void GetComponentNames(const TGetStrProc& Proc) = 0;
  virtual void MakeComponentLinkable(const String& RootName) = 0;
  /// The root stream is about to be written.
  virtual void BeforeSave() = 0;
  virtual void Notify(TNotifyCode Code) = 0;
  /// Swaps the module to its text.
  virtual void ViewAsText() = 0;
  /// The source text of one method.
  virtual String GetMethodSource(const String& Name) = 0;
  /// Adds pasted method bodies; fills `Inserted` with the names it inserted.
  virtual void InsertMethodSource(const String& Text, TStrings* Renames, TStrings* Inserted) = 0;
  virtual void GetProjectModules(const TGetModuleProc& Proc) = 0;
  /// The source may not be changed.
  virtual bool GetReadOnly() = 0;
  /// The unit of the module.
  virtual String GetUnitName() = 0;
  virtual void ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                         const IPtr<IEventInfo>& EventInfo) = 0;
  virtual void Save() = 0;
  virtual String GetFileName() = 0;
  /// Gives the host the chance to refuse a change; refuses by raising.
  virtual void CheckWritable() = 0;
  virtual void Close() = 0;
};

struct FK_API IDesignerViewModule : IDesignerModule {
  FK_INTERFACE(IDesignerViewModule, IDesignerModule, "{AEF995C4-E519-547D-838B-2CD5717CCBE5}")
};

/// The form changed while it was being loaded: the host treats it as modified.
struct FK_API IDesignerLoadingFormModified : IInterface {
  FK_INTERFACE(IDesignerLoadingFormModified, IInterface, "{0004BE68-5130-57F8-A1A7-CCA8D793A6DA}")
  virtual void LoadingFormModified() = 0;
};

//===----------------------------------------------------------------------===//
// The module on design
//===----------------------------------------------------------------------===//

/// The file side of a module on design.
struct FK_API IFile : IInterface {
  FK_INTERFACE(IFile, IInterface, "{319FC3B9-0745-5612-A3E8-AA2981A1E2C0}")
  virtual bool CheckFileDate() = 0;
  virtual bool FormFileOpen() = 0;
  virtual String GetFileName() = 0;
  virtual int GetModifyTime() = 0;
  virtual int GetTimeAtLoad() = 0;
  virtual void Rename(const String& NewFileName) = 0;
  virtual void Save() = 0;
};

/// A module on design, as the host and the designers see it.
struct FK_API IRoot : IFile {
  FK_INTERFACE(IRoot, IFile, "{6B87AE67-CD56-516C-A934-3931FB915661}")
  virtual void Close() = 0;
  virtual IPtr<IDesignerModule> GetModule() = 0;
  virtual TComponent* GetRoot() = 0;
  virtual String GetRootName() = 0;
  virtual void Hide() = 0;
  virtual void GoDormant() = 0;
  virtual void Show() = 0;
  virtual void ShowHelp() = 0;
  virtual IPtr<IDesigner> GetDesigner() = 0;
  virtual IPtr<IRoot> GetActiveView() = 0;
  virtual int GetViewCount() = 0;
  virtual IPtr<IRoot> GetView(int Index) = 0;
  virtual String GetViewName(int Index) = 0;
  virtual int GetViewIndex(const String& Name) = 0;
  virtual IPtr<IRoot> GetMasterView() = 0;
  virtual int AddView(const String& Name) = 0;
  virtual void GetViewPreview(TPersistent* Bitmap) = 0;
  virtual void GetViewPreview(const String& ViewName, TPersistent* Bitmap) = 0;
  virtual void RemoveView(const String& Name) = 0;
  virtual void RemoveView(int Index) = 0;
};

/// What the designers need of a module on design beyond `IRoot`.
struct FK_API IInternalRoot : IRoot {
  FK_INTERFACE(IInternalRoot, IRoot, "{9CBCCDAE-D53F-5747-8B8F-07DDBABF2CA6}")
  virtual void HideForModule() = 0;
  virtual void ShowForModule() = 0;
  virtual TClass GetCustomModuleClass() = 0;
  virtual TClass GetRootBaseClass() = 0;
  virtual TClass GetRootClass() = 0;
  virtual IPtr<ICustomModule> GetCustomModule() = 0;
  virtual IPtr<IUpdateManager> GetUpdateManager() = 0;
  /// The object behind the interface.
  virtual TObject* Implementor() = 0;
  virtual bool IsDormant() = 0;
  virtual void ModifiedUpdateNotification() = 0;
  virtual void PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) = 0;
  virtual void RemoveDependenciesOn(TComponent* Component) = 0;
  virtual void Resurrect() = 0;
  virtual void SetActive(bool Value) = 0;
  virtual void SetControlsLocked(bool Value) = 0;
  virtual void UpdateDependencies() = 0;
  virtual void UpdateOptions() = 0;
  virtual void SetActiveView(const IPtr<IRoot>& View) = 0;
  /// The module this one inherits from; null without an ancestor.
  virtual IPtr<IRoot> GetAncestorRoot() = 0;
  /// Asks the root to fill `List` with its current selection.
  virtual void GetSelections(const IPtr<IDesignerSelections>& List) = 0;
  virtual void CancelModes() = 0;
  virtual void CopySelectionToStream(TStream* Stream) = 0;
  virtual bool IsView() = 0;
  /// Help for a member of the selection; false when the root has none.
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

/// The one collection of designers.
struct FK_API IComponentDesigners : IInterface {
  FK_INTERFACE(IComponentDesigners, IInterface, "{8BC8F32B-4444-53DD-A40D-624670621E1F}")
  virtual bool DesignerActive() = 0;
  virtual void DesignerOptionsChanged() = 0;
  virtual bool FindFile(const String& Name, IPtr<IRoot>& Root) = 0;
  virtual IPtr<IComponentDesigner> GetActiveDesigner() = 0;
  virtual void HideWindows() = 0;
  virtual void ShowWindows() = 0;
  virtual void SetProjectName(const String& Name) = 0;
  virtual void SetControlsLocked(bool Value) = 0;
  virtual bool GetControlsLocked() = 0;
  virtual IPtr<IOTAAlignable> GetAlignable() = 0;
  virtual void GetSelection(const IPtr<IDesignerSelections>& List) = 0;
  virtual void SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                            const IPtr<IDesignerSelections>& Selections) = 0;
  virtual void ShowComponentHelp() = 0;
  /// The help type out-value: 0 keyword, 1 context.
  virtual bool SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) = 0;
  virtual void GetProperties(const TGetPropProc& Proc) = 0;
  virtual String GetFirstSelectionType() = 0;
  virtual String GetFirstSelectionUnit() = 0;
  virtual std::vector<String> RegisteredExtensions() = 0;
  virtual std::vector<TClass> InvalidDataModuleClasses() = 0;
  virtual IPtr<IComponentDesigner> DesignerFromExtension(const String& Ext) = 0;
  virtual bool RootComponentClass(TClass ComponentClass) = 0;
  virtual String GetCustomModuleIdentifier(const IPtr<ICustomModule>& CustomModule) = 0;
  virtual void DesignerDeactivated() = 0;
  virtual void ForEachDesigner(const TDesignerIterFunc& Func) = 0;
};

/// What designers and roots tell the collection.
struct FK_API IInternalComponentDesigners : IComponentDesigners {
  FK_INTERFACE(IInternalComponentDesigners, IComponentDesigners, "{63D7E0FE-EC71-5085-A84F-096C2D10A180}")
  virtual void RegisterDesigner(const IPtr<IComponentDesigner>& Designer) = 0;
  virtual void UnregisterDesigner(const IPtr<IComponentDesigner>& Designer) = 0;
  virtual void ActivateDesigner(const IPtr<IComponentDesigner>& Designer) = 0;
  virtual void RootRemoved(const IPtr<IRoot>& Root) = 0;
};

} // namespace formkit
