//===- core/root/ComponentRoot.h - One module on design ------------------===//
//
// `TComponentRoot` holds one module on design: the host's module record, the
// root component and everything it owns, the surface that shows it, its
// selection and its streams. It is the base of a framework's concrete root,
// which gives the window, the surface and the framework's answers through the
// abstract operations, and which the framework's designer creates:
//
//   IPtr<TKilnRoot> Root = New<TKilnRoot>();
//   Root->Create({Designer, Module, "Unit1.kfm", false, nullptr, "Form1"});
//   Root->Show();
//   Root->Close();     // leaves the designer's list; the object goes with its last reference
//
// The themes live in their own files: lifecycle and state (ComponentRoot.cpp),
// selection and instances (RootSelection.cpp), creation (RootCreation.cpp),
// names and their lookup across modules (RootNames.cpp), handlers bound to
// methods (RootMethods.cpp), the renames and handlers of a paste
// (RootPaste.cpp), the host's view of an object's events (RootCompInfo.cpp),
// the designer interface's forwards (RootDesigner.cpp), reading a module and a
// selection (RootReading.cpp), writing, saving and dependencies (RootWriting.cpp,
// RootStreams.cpp), copy, paste, delete and undelete (RootClipboard.cpp).
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignerTypes.h"
#include "core/ToolServices.h"
#include "core/root/ComponentDesignSurface.h"
#include "core/root/RootHooks.h"
#include "core/root/RootNames.h"
#include "core/root/RootStreams.h"
#include "platform/Lists.h"
#include "platform/Streams.h"

#include <unordered_map>

namespace formkit {

class TReader;
class TOTAFormEditor;

FK_EXCEPTION(ECannotDeleteNonComponentException, EComponentDesignerException);

FK_RESOURCESTRING(sRootClassNotFound, "Root class not found: \"%s\"");
FK_RESOURCESTRING(sReadOnlySource, "Source is read-only");
FK_RESOURCESTRING(sCannotInherit,
                  "Component class '%s' does not support inheritance and cannot be added to a module that has descendents");
FK_RESOURCESTRING(sCannotCreateComponentOnView, "This component can only be created on the Master View");
FK_RESOURCESTRING(sDuplicateViewName, "View \"%s\" already exists in module");
FK_RESOURCESTRING(sViewDoesntExist, "View \"%s\" does not exist in module");
FK_RESOURCESTRING(sRedirectLinks, "Module '%s' links to module '%s' which cannot be found in the current project.  "
                                  "Do you wish to remove/redirect the links to another module?");
FK_RESOURCESTRING(sAncestorDeleteWarning, "Reverting '%s' deletes all contained components not found in the ancestor "
                                          "and will delete the following: %s.  Continue?");
FK_RESOURCESTRING(sRenamingAncestor, "Cannot rename component %s, component was introduced in an ancestor form");
FK_RESOURCESTRING(sComponentAlreadyExists, "A component named %s already exists in a descendant module");
FK_RESOURCESTRING(sRootMustHaveName, "Root component must have a name");
FK_RESOURCESTRING(sAncestorClassName, "Cannot rename a module to the same name as one of its ancestors (%s)");
FK_RESOURCESTRING(sServiceNotAvailable, "%s is not available");
FK_RESOURCESTRING(sCannotPasteForm, "Cannot paste a form or datamodule into another form or datamodule");
FK_RESOURCESTRING(sNestedInsertedInSelf, "A nested component cannot be inserted into itself");

/// What the user chose for an error while a module is read.
enum TRootReadErrorResult : std::uint8_t {
  rerOK,        ///< go on past this error
  rerCancel,    ///< give up the read
  rerIgnoreAll  ///< go on past this and every further error of this read
};

/// What the user chose for an inherited component that the ancestor no longer has.
enum TRecoveryResult : std::uint8_t {
  rrDelete, ///< drop the component's data
  rrRename, ///< it is the ancestor's component of another name
  rrCreate, ///< make it anew, as the module's own
  rrCancel  ///< give up: the reader reports its error
};

/// The answer to a yes/no/cancel question.
enum TQueryRedirectLinksResult : std::uint8_t { qrYes, qrNo, qrCancel };

/// The answer to the warning that reverting a component deletes what the ancestor lacks.
enum TDeleteWarnResult : std::uint8_t { dwYes, dwNo, dwCancel };

/// Mirrors the children of a module right to left.
struct FK_API IFlipChildren : IInterface {
  FK_INTERFACE(IFlipChildren, IInterface, "{EC71B51F-B812-42B2-865B-44E7819686F7}")
  /// `Value` false flips every child of the root; true only the selected ones.
  virtual void FlipChildren(bool Value) = 0;
};

/// A palette entry that can make its component.
struct FK_API IInternalPaletteItem : IInterface {
  FK_INTERFACE(IInternalPaletteItem, IInterface, "{F9D448F1-50BC-11D1-9FB5-0020AF3D82DA}")
  /// Makes the component in `Owner` under `Parent`; null ends the creation silently.
  virtual TComponent* CreateComponent(TComponent* Owner, TComponent* Parent, const IPtr<IDesignerModule>& Module,
                                      const TRect& Rect) = 0;
};

/// The bridge from a class to the palette-item path: constructs the class with `Owner`.
class FK_API TClassPaletteItem : public TInterfacedObject, public IInternalPaletteItem {
  FK_CLASS(TClassPaletteItem, TInterfacedObject)
  FK_INTERFACES(IInternalPaletteItem)
  explicit TClassPaletteItem(TClass ComponentClass = nullptr) : FComponentClass(ComponentClass) {}
  TComponent* CreateComponent(TComponent* Owner, TComponent*, const IPtr<IDesignerModule>&, const TRect&) override {
    return formkit::CreateComponent(FComponentClass, Owner);
  }

private:
  TClass FComponentClass;
};

/// The root's view of its selection: persistents where the surface speaks of items. It
/// listens to the surface's list without being kept alive by it.
class FK_API TSelections : public TInterfacedObject, public ISelectionsListener {
  FK_CLASS(TSelections, TInterfacedObject)
  FK_INTERFACES(ISelectionsListener)
  explicit TSelections(const IPtr<ISelections>& Selections = nullptr);
  void BeforeDestruction() override;

  int GetCount() { return FSelections ? FSelections->GetCount() : 0; }
  TPersistent* GetPersistents(int Index);
  /// The first item whose persistent is `Instance`, or null.
  IPtr<IItem> FindItemFor(TPersistent* Instance);
  void SelectionChanged(const IPtr<ISelections>& Selections) override;
  const IPtr<ISelections>& Items() const noexcept { return FSelections; }

  std::function<void()> FOnChanged;

private:
  IPtr<ISelections> FSelections;
};

/// The class group a module's components are taken from, as the module keeps it: known
/// once a name was chosen. The root of a module answers it.
struct FK_API IModuleClassGroup : IInterface {
  FK_INTERFACE(IModuleClassGroup, IInterface, "{3F0E1C52-9B7D-4E0A-8C61-2D5A7B94E1F3}")
  /// The qualified name of the group's class; empty while none was chosen.
  virtual String GetClassGroupName() = 0;
  /// The class of that name, or null when it is unknown or not a persistent class.
  virtual TClass GetClassGroupClass() = 0;
  /// Whether a group was chosen.
  virtual bool ClassGroupKnown() = 0;
  /// Chooses the group by qualified class name; empty forgets it.
  virtual void SetClassGroupName(const String& Name) = 0;
};

/// One module on design. See the file comment.
class FK_API TComponentRoot : public TInterfacedObject,
                              public IInternalRoot,
                              public IDesigner,
                              public IOTAAlignable,
                              public IFlipChildren,
                              public ISurfaceHost,
                              public IModuleClassGroup,
                              public IDesignLocalMenu {
  FK_CLASS(TComponentRoot, TInterfacedObject)
  FK_INTERFACES(IInternalRoot, IDesigner, IOTAAlignable, IFlipChildren, ISurfaceHost, IModuleClassGroup,
                IDesignLocalMenu)
  // The tool facade (RootFormEditor.cpp) works on the module's streams and widget tree.
  friend class TOTAFormEditor;
  friend class TOTAComponent;
  friend class TAncestorNotifier;

  /// What a module on design is made from.
  struct TCreateArgs {
    IPtr<IComponentDesigner> Designer;
    IPtr<IDesignerModule> Module;
    String FileName;
    bool Existing = false;
    IPtr<IDatedStream> Stream;
    String FormName;
    String AncestorName;
    String FileSystem;
    IPtr<IRoot> AncestorRoot;
    String ViewName;
  };

  /// The constructor logic: joins the designer's list, makes or reads the module, opens
  /// the designer. A failure leaves the designer's list as it was and passes on.
  virtual void Create(const TCreateArgs& Args);
  void BeforeDestruction() override;

  // Fields the framework's root reads -------------------------------------------------
  TComponent* Root() const noexcept { return FRoot; }
  const IPtr<IComponentDesignSurface>& Surface() const noexcept { return FSurface; }
  const IPtr<ISurfaceDesigner>& SurfaceDesigner() const noexcept { return FSurfaceDesigner; }
  /// The surface-level selection list the root created; the surface and engine share it.
  IPtr<ISelections> SelectionItems() const { return FSelections ? FSelections->Items() : nullptr; }
  int ModifyTime() const noexcept { return FModifyTime; }
  bool IsClosing() const noexcept { return FClosing; }
  IPtr<IDesigner> AsDesigner() { return IPtr<IDesigner>(static_cast<IDesigner*>(this)); }
  /// Whether `Component` is a nested frame whose insides this module may change.
  bool ModifiableFrame(TComponent* Component) const { return IsModifiableFrame(Component); }
  IPtr<IRoot> AsRoot() { return IPtr<IRoot>(static_cast<IInternalRoot*>(this)); }
  // The class group chosen for the module (RootClassGroup.cpp) ---------------------------
  String GetClassGroupName() override { return FClassGroupName; }
  TClass GetClassGroupClass() override;
  bool ClassGroupKnown() override { return !FClassGroupName.empty(); }
  /// Keeps the name; whoever changes it reports the change.
  void SetClassGroupName(const String& Name) override;

  /// The module's local menu as the host's menu layer builds it; null when the host has
  /// no menu layer.
  IPtr<IPopupMenu> BuildLocalMenu(TLocalMenuTypes Filter) override;

  /// The module as its surface sees it.
  IPtr<ISurfaceHost> AsSurfaceHost() { return IPtr<ISurfaceHost>(static_cast<ISurfaceHost*>(this)); }
  /// The module's tool facade, made on first use and kept until the root goes
  /// (RootFormEditor.cpp).
  IPtr<IOTAFormEditor> GetFormEditor();

  // Lifecycle and state -------------------------------------------------------------------
  TClass GetRootClass() override;
  String GetDesignClassName();
  String GetAncestorName();
  String GetRootClassName() override;
  String GetRootName() override;
  void SetRootName(const String& Name);
  void Modified() override;
  void ModifiedUpdateNotification() override;
  void UpdateOptions() override;
  /// Shows the design window: a view makes itself its master's active view first, a
  /// master shows its active view's window.
  void Show() override;
  void ShowAs(TShowState State);
  /// Hides the design window of a view, or of a master's active view.
  void Hide() override;
  /// Closes the module, its views first. A view lets go of its master here, so a master
  /// and its views, which hold each other, are freed once the host lets go of them.
  void Close() override;
  void SetActive(bool Value) override;
  void SetControlsLocked(bool Value) override;
  bool CanModify();
  bool IsSourceReadOnly() override;
  /// Raises `EComponentDesignerException` "Source is read-only", or what the host raises.
  void ValidateModification() override;
  void Edit(TComponent* Component) override;

  // Selection and instances ---------------------------------------------------------------
  void GetSelections(const IPtr<IDesignerSelections>& List) override;
  IPtr<IDesignerSelections> GetSelection();
  TPersistent* SelectedPersistent();
  TComponent* SelectedComponent();
  bool IsRootSelected();
  IPtr<IItem> FindSelection(TPersistent* Persistent);
  bool IsAnchorSelection(TPersistent* Persistent);
  void SetSelections(const IPtr<IDesignerSelections>& List) override;
  void SetSelection(const String& Name);
  void SelectComponent(TPersistent* Instance) override;
  void SelectComponent(const IPtr<IDesignObject>& Instance) override;
  /// Virtual: forwards to `Select`.
  virtual void SelectComponent(TPersistent* Instance, bool Add);
  void Select(TPersistent* Instance, bool Add);
  void ClearSelection() override;
  void NoSelection() override;
  IPtr<IComponentEditor> GetComponentEditor();
  void CanInsertComponent(TComponent* Component) override;
  void InstanceInserted(TPersistent* Instance) override;
  void InstanceRemoved(TPersistent* Instance) override;
  void EditComponent(TComponent* Component);
  int GetCompCount();
  TComponent* CompIndexToComponent(int Index);
  String GetCompName(int Index);
  String GetCompType(int Index);
  String FindCompClass(const String& Name);
  void Notification(TPersistent* AnObject, TOperation Operation) override;

  // Creation ------------------------------------------------------------------------------
  TComponent* DoCreateComponent(const IPtr<IInternalPaletteItem>& PaletteItem, IPtr<IItem> Parent, TRect Rect,
                                bool SetBounds, bool Scaled);
  void CreateComponent(const IPtr<IInternalPaletteItem>& PaletteItem);
  TComponent* CreateComponent(TClass ComponentClass, TComponent* Parent, int Left, int Top, int Width,
                              int Height) override;
  void CreateComponentPos(const IPtr<IInternalPaletteItem>& PaletteItem, int X, int Y);
  TComponent* CreateCurrentComponent(TComponent* Parent, const TRect& Rect) override;
  TComponent* CreateCurrentComponentScaled(TComponent* Parent, const TRect& Rect, bool Scaled) override;
  TComponent* CreateChild(TClass ComponentClass, TComponent* Parent) override;
  /// Instantiates the module of a proxy class as a nested frame owned by `Owner`; null
  /// when the class is no proxy class or no module has it.
  TComponent* FrameCreateComponent(TClass ComponentClass, TComponent* Owner);
  /// The root component of the module a nested frame instance copies, or null.
  TComponent* GetInliningComponent(TComponent* Component) const;
  IPtr<IItem> FindCurrentParentItem();
  TComponent* FindCurrentParent();
  TComponent* GetCurrentParent() override { return FindCurrentParent(); }
  IPtr<IItem> FindItemParent(const IPtr<IItem>& Item);
  void ForceCommonParent();
  void ValidateComponent(TComponent* Component);

  // Names ---------------------------------------------------------------------------------
  /// A free name for a component of class `BaseName`: "TButton" gives "Button1",
  /// "Button2", ... (a leading "T" goes when more follows), free in the module and, with
  /// inheritance support, in its descendants. Cost: one lookup per number tried.
  String UniqueName(const String& BaseName) override;
  /// Checks a rename before the component framework stores it, and carries it to the
  /// host's source, the descendants, the form editor, the dependent modules and the
  /// listeners, in that order. `Component` null or the root component: the module is
  /// renamed. Raises `EComponentDesignerException`, or what the host raises, to refuse;
  /// nothing has changed then.
  void ValidateRename(TComponent* Component, const String& CurName, const String& NewName) override;
  /// Renames component `CurName` of the module through its name's setter; false when
  /// there is none of that name.
  bool RenameComponent(const String& CurName, const String& NewName);
  /// The root component of the open module named `Name` (any designer), or null.
  [[nodiscard]] TComponent* FindRootComponent(const String& Name);
  /// Called with each name the host gives while it lists the modules this one links to.
  void AddImportedRoot(const String& Name);

  // Handlers bound to methods -------------------------------------------------------------
  /// The source's methods that fit `EventInfo`, from the host.
  void GetMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc);
  /// Asks the host to insert a call to `InstanceMethod` of `InstanceName` into
  /// `MethodName`.
  void ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                 const IPtr<IEventInfo>& EventInfo);
  /// Renames method `CurName` of the root's class to `NewName`, keeping its code, so the
  /// events that hold it follow; nothing when the class has no such method.
  void RenameRootMethod(const String& CurName, const String& NewName);
  /// The reader's hook while a module is read: a handler named in the module gets a method
  /// of the root's class.
  void FindObjectMethod(TReader* Reader, const String& MethodName, void*& Address, bool& Error);
  /// Whether `PropInfo` of `Instance` differs from the ancestor's and can go back to it.
  bool CanRevert(TPersistent* Instance, PPropInfo PropInfo);

  // Updates from the ancestor -------------------------------------------------------------
  /// An update of the module by its family's update manager begins: renames of what the
  /// ancestor introduced are let through until `Updated`.
  void Updating(const IPtr<IUpdateManager>& Manager);
  /// The update by `Manager` ended: renames are checked again, the surface follows, the
  /// module's own manager hears of a nested frame's update, and the listeners that care
  /// hear that a descendant was updated.
  void Updated(const IPtr<IUpdateManager>& Manager);

  // Paste: renames and handlers of one pasted text ----------------------------------------
  /// Empties the paste state and sets the reader's hooks for names, references and
  /// methods to this module's.
  void BeginPasteRead(TReader* Reader);
  /// The steps after the components of a paste were read, in order: the handlers get
  /// their final names (`RenameEvents`); the method text after the components (up to
  /// its first zero byte) goes to the host with the renames (`InsertMethodSource`); the
  /// handlers the host did not insert fall back on the class's method of their pasted
  /// name, or on nothing (`VerifyEvents`); the selected objects' events follow
  /// (`UpdateEvents`). The paste state stays until `EndPasteRead`.
  void FinishPasteRead(TReader* Reader);
  /// Forgets the paste state: the paste is over, or failed.
  void EndPasteRead() noexcept;
  /// The reader's hook for a pasted component's name: a name the module has is replaced
  /// by a free one, and the rename is kept.
  void ReaderSetName(TReader* Reader, TComponent* Component, String& Name);
  /// The reader's hook for a reference inside the pasted text: it follows the renames.
  void ReaderReferenceName(TReader* Reader, String& Name);
  /// The reader's hook for a handler named in the pasted text: one temporary method per
  /// distinct name, "@1", "@2", ... (a counter of the process).
  void ReaderFindMethod(TReader* Reader, const String& MethodName, void*& Address, bool& Error);
  /// Gives the temporary methods their final names: a handler of a renamed component
  /// follows it (Button1Click of Button1, now Button3, becomes Button3Click), and a name
  /// the class has already gets a number (Button3Click2).
  void RenameEvents();
  /// The handlers whose names are not in `Inserted` (the methods the host put into the
  /// source) lose their temporary method and fall back on the class's method of their
  /// pasted name, or on nothing.
  void VerifyEvents(TStrings* Inserted);
  /// Moves the selected objects' events from temporary methods to their final ones.
  void UpdateEvents();
  /// Called for each method property met; true stops the walk of the object that has it.
  using TMethodPropProc = std::function<bool(TPersistent* Instance, PPropInfo PropInfo)>;
  /// Walks the method properties of each selected object, of the sub-objects below it and
  /// of the components streamed under it.
  void IterateMethods(const TMethodPropProc& Proc);
  /// The components and handlers renamed by the paste under way.
  const TRenames& Renames() const noexcept { return FRenames; }
  /// The handlers met by the paste under way.
  TEvents& Events() noexcept { return FEvents; }

  // Module reading ------------------------------------------------------------------------
  /// Reads the module from `Stream` (binary or text) into a new root component, over a
  /// copy of `AncestorRoot`'s (or of the ancestor the stream names, opened when needed).
  /// A failure frees what was made and passes on.
  void CreateFromStream(TStream* Stream, const IPtr<IRoot>& AncestorRoot);
  /// `Stream` in binary form: `Stream` itself, or a new stream the caller frees. With
  /// `AtLoad` the module remembers whether it came as text.
  [[nodiscard]] TStream* PrepareInputStream(TStream* Stream, bool AtLoad);
  /// Peeks at the class and the ancestor class a module stream names; the stream stays
  /// where it stood.
  void GetCreateInfoFrom(TStream* Stream, String& ClassName, String& AncestorClassName,
                         const IPtr<IRoot>& AncestorRoot);
  /// Reads component data into `Instance` (the root or a nested frame) with the module's
  /// reader hooks and class group.
  virtual void ReadObjectFromStream(TComponent* Instance, TStream* Stream);
  /// Opens, through the host, the modules that `Root`'s unresolved references name.
  void LoadDependentModules(TComponent* Root);
  /// A selection read: the components of `Stream` (a selection stream) join the module
  /// under `Parent`, renamed where their names are taken, and are selected. `Adjust` moves
  /// them into `Rect`.
  void ReadStream(TStream* Stream, TComponent* Parent, bool Adjust, const TRect& Rect);
  /// A selection read into the master of the active module, which is selected after.
  void SelectReadStream(TStream* Stream, TComponent* Parent, bool Adjust, const TRect& Rect);
  /// The module came from a text form file, and is written as text.
  bool GetTextLYT() const noexcept { return FLYTToText; }
  /// From the next write on, the module is written as text (true) or in binary.
  void SetTextLYT(bool AsText) noexcept {
    FLYTToText = AsText;
    FOrigLYTFormat = AsText ? 2 : 1;
    FreeRootStream();
  }
  /// What was read may differ from the stream: an error was passed over.
  bool HadReadError() const noexcept { return FReadError; }
  // The reader's hooks while the module is read.
  void ReaderObjectError(TReader* Reader, const String& Message, bool& Handled);
  void ReaderAncestorNotFound(TReader* Reader, const String& ComponentName, TClass ComponentClass,
                              TComponent*& Component);
  void ReaderFindComponentClass(TReader* Reader, const String& ClassName, TClass& ComponentClass);
  void ReaderCreateComponent(TReader* Reader, TClass ComponentClass, TComponent*& Component);
  /// The callback of a selection read for each component read: checks and selects it.
  void ComponentRead(TComponent* Component);
  void ComponentReadAdjust(TComponent* Component);

  // Module writing and dependencies -------------------------------------------------------
  /// The module's image, at position 0; cached until the next change. Not the caller's.
  TStream* GetRootStream();
  /// Writes the module into `Stream`: as the difference against its ancestor, in text
  /// when it came as text. Raises when the module links to modules that are not open.
  void WriteRootStream(TStream* Stream);
  /// The writer's hook: a nested frame is written against the module it copies.
  void WriterFindAncestor(TWriter* Writer, TComponent* Component, const String& Name, TComponent*& Ancestor,
                          TComponent*& RootAncestor);
  /// Writes `Component` with the module's writer hook (the update manager's callback).
  void WriteComponent(TWriter* Writer, TComponent* Component);
  /// Works out the modules this one links to, once per change.
  void UpdateDependencies() override;
  void GetDependencies(const std::function<void(const IPtr<IRoot>&)>& Proc);
  void GetDependentRoots(const std::function<void(const IPtr<IRoot>&)>& Proc);
  void ClearDependencies();
  void ClearDependents();
  void ClearDependenciesOn(TComponent* Component);
  void RemoveDependentLinks();
  /// The module on design of `Component`'s root, or of the module named `Name`; null.
  TComponentRoot* GetComponentRootFor(TComponent* Component);
  TComponentRoot* GetComponentRootFor(const String& Name);
  /// Calls `Proc` with the unit of each class the module's components need.
  void GetUnits(const TGetStrProc& Proc);
  /// The module's image goes to a `TRootStream`: the module forgets it.
  void LendRootStream() noexcept { FRootStream = nullptr; }
  /// A lent image comes back: kept when the module is as it was at `ModifyTime` and has
  /// no newer image; false when the lender must free it.
  [[nodiscard]] bool TakeBackRootStream(TMemoryStream* Image, int ModifyTime) noexcept;

  // Positioning the selection ----------------------------------------------------------------
  /// Lines up, spaces, centres or reorders the selection, relative to its first item.
  /// Nothing while the root is selected or the controls are locked.
  void Align(TOTAAffect Affect) override;
  /// Sizes the selection: to the largest, the smallest, the first item's, or `Value`.
  void Size(TOTASizeAffect Affect, int Value) override;
  /// Moves each selected item's top left corner onto the grid.
  void AlignToGrid();
  void BringToFront() { ZOrder(true); }
  void SendToBack() { ZOrder(false); }
  void ZOrder(bool Front);
  /// Selects every component of the module that has an icon or a place on the surface.
  void SelectAll();
  /// The host shows one of its design dialogs.
  void Dialog(TDesignDialog Kind) override;
  void Command(TDesignCommand Kind) override;
  void FlipChildren(bool Value) override { FlipRootChildren(!Value); }
  /// Whether the revert command is offered: an inherited component is selected, the
  /// module has no descendants, and the root is not selected.
  [[nodiscard]] bool CanRevert();

  // Clipboard and deletion ----------------------------------------------------------------
  /// Writes the selection as a selection stream: a bounding rectangle when `WithRect`,
  /// the components, and with `WithMethods` the source of their handlers.
  void StreamSelection(TStream* Stream, bool WithMethods, TStrings* Units, bool WithRect);
  bool CanUndelete() const noexcept { return FUndoStream != nullptr; }
  /// Puts the last deleted selection back where it stood.
  void DoUndelete();
  /// The components that can be selected: the module's, then those of its nested frames.
  void EnsureSelectableComponents();
  int GetSelectableComponentCount() override;
  TComponent* GetSelectableComponents(int Index) override;
  /// Puts a component stream on the clipboard, with its text.
  void CopyStreamToClipboard(TStream* Stream);
  /// A new stream of the components on the clipboard (component data or text); the
  /// caller frees it.
  [[nodiscard]] TMemoryStream* GetClipboardStream();
  /// Reads the bounding rectangle a selection stream may start with; an empty rectangle
  /// when the stream starts with a component.
  static TRect ReadSelectionBounds(TReader* Reader);
  /// Whether `Text` starts, after blanks, with "object" or "inline" in any case.
  [[nodiscard]] static bool PossibleStream(std::string_view Text);
  bool IsFrame(TPersistent* Instance) const;

  // IFile, IRoot, IInternalRoot: plain reads and forwards ---------------------------------
  /// True when the file changed on disk since it was loaded or saved; takes its new age.
  bool CheckFileDate() override;
  IPtr<IDatedStream> FormFileOpen() override;
  String GetFileName() override { return FFileName; }
  int GetModifyTime() override { return FModifyTime; }
  int GetTimeAtLoad() override { return FDiskAge; }
  void Rename(const String& NewFileName) override;
  void Save() override;
  IPtr<IDesignerModule> GetModule() override { return FModule; }
  TComponent* GetRoot() override { return FRoot; }
  /// Gives up the live components, the surface and the update managers, keeping the
  /// module's stream. Not for a module that is dormant already.
  void GoDormant() override;
  void ShowHelp() override;
  IPtr<IDesigner> GetDesigner() override { return AsDesigner(); }
  void RemoveView(const String& Name) override;
  void RemoveView(int Index) override;
  void HideForModule() override { Hide(); }
  void ShowForModule() override { Show(); }
  TClass GetCustomModuleClass() override { return FCustomModuleClass; }
  TClass GetRootBaseClass() override { return GetRootClass(); }
  IPtr<ICustomModule> GetCustomModule() override { return FCustomModule; }
  IPtr<IUpdateManager> GetUpdateManager() override { return FRootUpdateManager; }
  TObject* Implementor() override { return this; }
  bool IsDormant() override { return FDormantStream != nullptr; }
  void PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) override;
  void RemoveDependenciesOn(TComponent* Component) override;
  /// Brings a dormant module back from its stream; nothing for a live one. A failed read
  /// passes on and leaves the module dormant with its stream.
  void Resurrect() override;
  IPtr<IRoot> GetAncestorRoot() override { return IPtr<IRoot>(FAncestorRoot); }
  void CancelModes() override;
  void CopySelectionToStream(TStream* Stream) override;
  bool SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) override;

  // Views: alternate forms of one module, stored as their differences (RootViews.cpp) ---
  // A view is a root of its own whose ancestor is the master root of the same module.
  // The master owns its views; on a view, the operations that say so go to the master.
  /// The view shown now: this root while no view is active. Goes to the master.
  IPtr<IRoot> GetActiveView() override;
  /// The number of the master's views; 0 on a view.
  int GetViewCount() override;
  /// View `Index`; raises `EListError` for an index outside the list.
  IPtr<IRoot> GetView(int Index) override;
  /// The name of view `Index`; raises `EListError` for an index outside the list.
  String GetViewName(int Index) override;
  /// This view's own name; empty on a master.
  String GetViewName() const { return FViewName; }
  /// The first view named `Name` without regard to case, or -1. Goes to the master.
  int GetViewIndex(const String& Name) override;
  /// The master of a view: its ancestor when that is a root of the same module; null
  /// for a master, even one with an ancestor of its own.
  IPtr<IRoot> GetMasterView() override;
  /// Adds an empty view named `Name` and gives its index; -1 without a host that keeps
  /// views. Raises `sDuplicateViewName` for a name of the view list. Goes to the master.
  int AddView(const String& Name) override;
  /// Draws this root's own preview into `Bitmap` (the caller's): the framework's.
  void GetViewPreview(TPersistent* Bitmap) override = 0;
  /// Draws the view `ViewName`, or the frame of a device of that name when the module
  /// has no such view, into `Bitmap`. Goes to the master.
  void GetViewPreview(const String& ViewName, TPersistent* Bitmap) override;
  /// Makes `View` (this master, or one of its views) the one shown; raises
  /// `EArgumentException` for another root. Goes to the master.
  void SetActiveView(const IPtr<IRoot>& View) override;
  bool IsView() override { return GetMasterView() != nullptr; }
  /// Makes the views of a module just opened or created: those a creator (`Source`
  /// answering to `IDesignerViewsCreator`) brings, and those the view list names.
  void CreateDesignerViews(const IPtr<IInterface>& Source);
  /// Closes every view, the last first; they stay the master's.
  void CloseViews();
  /// The item of the master that stands for `Item` of this view: the master's root for
  /// this root, the component of the same name for another. `Item` itself on a master.
  [[nodiscard]] IPtr<IItem> GetMasterViewComponent(const IPtr<IItem>& Item);

  // IDesigner: what the designer interface adds ----------------------------------------
  void Activate() override;
  TMethod CreateMethod(const String& Name, const TTypeData* TypeData) override;
  TMethod CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) override;
  String GetMethodName(const TMethod& Method) override;
  void GetMethods(const TTypeData* TypeData, const TGetStrProc& Proc) override;
  bool MethodExists(const String& Name) override;
  void RenameMethod(const String& CurName, const String& NewName) override;
  void ShowMethod(const String& Name) override;
  void ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                 const TTypeData* TypeData) override;
  void DeleteSelection(bool ADoAll) override;
  /// The selection, without the root.
  void DeleteSelection() override { DeleteSelection(false); }
  TComponent* GetComponent(const String& Name) override;
  String GetComponentName(TComponent* Component) override;
  void GetComponentNames(const TTypeData* TypeData, const TGetStrProc& Proc) override;
  TPersistent* GetObject(const String& Name) override;
  String GetObjectName(TPersistent* Instance) override;
  void GetObjectNames(const TTypeData* TypeData, const TGetStrProc& Proc) override;
  bool IsComponentLinkable(TComponent* Component) override;
  void MakeComponentLinkable(TComponent* Component) override;
  bool IsComponentHidden(TComponent* Component) override;
  void GetProjectModules(const TGetModuleProc& Proc) override;
  IPtr<IDesigner> GetAncestorDesigner() override;
  TComponent* FindRootAncestor(const String& Name) override;
  void ModuleFileNames(String& ImplFileName, String& IntfFileName, String& FormFileName) override;
  IPtr<IOTABasePaletteItem> GetPaletteItem(TClass ComponentClass) override;
  void Revert(TPersistent* Instance, PPropInfo PropInfo) override;
  String GetPathAndBaseExeName() override;
  String GetPrivateDirectory() override;
  String GetBaseRegKey() override;
  bool GetIsDormant() override { return IsDormant(); }
  void ModalEdit(char EditKey, const IPtr<IActivatable>& ReturnWindow) override;
  void SelectItemName(const String& PropertyName) override;
  String GetAppDataDirectory(bool Local) override;
  String GetDesignerExtension() override;
  IPtr<IInterface> GetIDEOptions() override;
  TRect GetScrollRanges(const TPoint& ScrollPosition) override;
  bool MethodFromAncestor(const TMethod& Method) override;
  /// The host's keys and buttons held now; empty without an environment.
  TShiftState GetShiftState() override;

  IPtr<IDesignEnvironment> GetEnvironment();
  /// The clipboard of the platform the framework runs on; windows beside the designer
  /// copy and paste through it too.
  virtual TDesignClipboard& Clipboard() = 0;

protected:
  // The framework's part --------------------------------------------------------------
  /// Hide, show, show in a state: the design window.
  virtual void HideRootWindow() = 0;
  virtual void ShowRootWindow() = 0;
  virtual void ShowRootWindowAs(TShowState State) = 0;
  /// Before the root is destroyed.
  virtual void TearDownRoot() = 0;
  /// Frees the root component.
  virtual void DestroyRootInstance(TComponent* Instance) = 0;
  /// A new module without a stream was made; the last step.
  virtual void NewRootCreated(TComponent* Instance, const String& ClassName) = 0;
  /// Must create `FSurface` and `FSurfaceDesigner` and the window behind them.
  virtual void InitializeSurface() = 0;
  /// The instance has memory but no constructor has run: give it its designer link.
  virtual void InitRootInstance(TComponent* Instance) = 0;
  /// A new module without an ancestor: its first state.
  virtual void InitNewRoot(TComponent* Instance, const String& ClassName) = 0;
  /// The root's constructor and the custom module are done.
  virtual void RootInstanceReady() = 0;
  /// The root component of any component: the topmost component that holds it, or null.
  /// Links across modules are made to the module of that root.
  virtual TComponent* RootOf(TComponent* Component) = 0;
  /// Whether `GetComponentNames` offers the module's root component among the module's
  /// own names.
  virtual bool OffersRootName() = 0;
  /// Widget-tree questions.
  virtual int GetControlCount(TComponent* Component) = 0;
  virtual TComponent* GetControl(TComponent* Component, int Index) = 0;
  virtual bool IsControl(TComponent* Component) = 0;
  virtual TComponent* GetParent(TComponent* Component) = 0;
  /// A component joined the module by streaming a nested frame.
  virtual void FrameComponentAdded(TComponent* Component) = 0;
  /// Asks the user about an error while the module is read; `Message` is the reader's.
  virtual TRootReadErrorResult AskReadError(const String& Message) = 0;
  /// Asks the user what an inherited component of the stream, `NewName`, is now that
  /// the ancestor `AncestorName` of `RootName` lacks it; `Candidates` (comma text) are
  /// the inherited components it could be. May change `NewName`.
  virtual TRecoveryResult AskAncestorRecovery(const String& RootName, const String& AncestorName, String& NewName,
                                              const String& Candidates, bool Nested) = 0;
  /// Asks whether the links of module `RootName` to the missing module `LinkedName` are
  /// to be removed or redirected.
  virtual TQueryRedirectLinksResult AskRedirectLinks(const String& RootName, const String& LinkedName) = 0;
  /// Removes or redirects the links of `Root` to module `LinkedName`.
  virtual void RedirectLinks(TComponent* Root, const String& LinkedName) = 0;
  /// Whether the generated class of another module may stand nested in this one.
  virtual bool CanNestClass(TClass Class) = 0;
  /// The class group activated around every read: the framework's.
  virtual TClass GetClassGroup() = 0;
  /// Before the reader runs on `Instance` in `ReadObjectFromStream`.
  virtual void BeforeReadRoot(TComponent*) {}
  /// Around the read of a selection.
  virtual void BeforeReadSelection() {}
  virtual void AfterReadSelection() {}
  /// Moves a pasted component: from `Bounds`, the rectangle the selection had, into `Rect`.
  virtual void AdjustReadComponent(TComponent* Component, const TRect& Rect, const TRect& Bounds) = 0;
  /// After the construction of a root instance failed or its read failed.
  virtual void RootCreationFailed() {}
  /// Asks whether reverting `ComponentName` may delete its own children `Names`.
  virtual TDeleteWarnResult AskDeleteWarning(const String& ComponentName, const String& Names) = 0;
  /// Mirrors the children of the root (`AllChildren`) or of the selection, right to left.
  virtual void FlipRootChildren(bool AllChildren) = 0;
  /// Draws the frame of the device `ViewName`, for which the module has no view, into
  /// `Bitmap` (the caller's).
  virtual void RenderViewPreview(const String& ViewName, TPersistent* Bitmap) = 0;

  // State -------------------------------------------------------------------------------
  IPtr<IInternalComponentDesigner> FDesigner;
  IPtr<IDesignerModule> FModule;
  IPtr<IComponentDesignSurface> FSurface;
  IPtr<ISurfaceDesigner> FSurfaceDesigner;
  IPtr<IUpdateManager> FRootUpdateManager;
  IPtr<IInterfaceList> FUpdateManagers;
  IPtr<IInternalRoot> FAncestorRoot;
  /// The tool facade: the object, and the one reference the root holds; null until asked.
  TOTAFormEditor* FOTAFormEditor = nullptr;
  IPtr<IOTAFormEditor> FOTAFormEditorRef;
  /// Watches the ancestor's module, so that this root forgets an ancestor that goes.
  IPtr<IOTAModuleNotifier> FAncestorRootNotifier;
  IPtr<IComponentEditor> FRootEditor;
  IPtr<ICustomModule> FCustomModule;
  String FFileSystem;
  String FFileName;
  String FRootBaseClass;
  String FRootName;
  String FViewName;
  /// The module record as a keeper of views; null when the host keeps none.
  IPtr<IDesignerViewModule> FViewModule;
  /// One view of a master: its name and its root, which the master owns.
  struct TDesignerView {
    String Name;
    IPtr<IInternalRoot> Root;
  };
  /// The master's views, in the order of the module's view list; empty on a view.
  std::vector<TDesignerView> FDesignerViews;
  /// The index of the view shown; -1 for the master itself.
  int FActiveView = -1;
  TComponent* FRoot = nullptr;
  TClass FRootClass = nullptr;
  TClass FCustomModuleClass = nullptr;
  String FClassGroupName; // qualified name of the module's class group; empty while unknown
  IPtr<TSelections> FSelections;
  IPtr<IInterfaceList> FMarkedItems;
  TMemoryStream* FRootStream = nullptr;
  /// The module's stream while it is dormant; owned.
  TMemoryStream* FDormantStream = nullptr;
  /// The last deleted selection and the parent it stood under; owned.
  TMemoryStream* FUndoStream = nullptr;
  TComponent* FUndoParent = nullptr;
  /// Receives the units a written selection needs, while `StreamSelection` runs.
  TStrings* FUnitDependencies = nullptr;
  /// The modules this one links to (with repeats), kept until the next change.
  std::vector<TComponentRoot*> FDependencies;
  std::vector<TComponent*> FSelectableComponents;
  TRect FAdjustmentRect{};
  TRect FAdjustmentBounds{};
  std::int64_t FReadStreamSize = 0;
  int FOrigLYTFormat = 0;
  bool FLYTToText = false;
  bool FDependenciesUpToDate = false;
  bool FIgnoringErrors = false;
  bool FIgnoreNext = false;
  /// The modules whose streams refer to this one: their stored streams go stale when a
  /// name here changes. Kept by the dependency tracking of module writing.
  std::vector<TComponentRoot*> FDependents;
  TRenames FRenames;
  TEvents FEvents;
  /// The names the host gives of the modules this one links to; filled only during
  /// `GetComponentNames` and `IsComponentLinkable`.
  std::vector<String> FImportedRootList;
  std::vector<TComponent*> FModifiableFrames;
  /// Nested frame instance to the root component of the module it copies.
  std::unordered_map<TComponent*, TComponent*> FInliningComponents;
  int FModifyTime = 0;
  int FDiskAge = 0;
  bool FCreateContainers = true;
  bool FRevertingComponent = false;
  bool FReadError = false;
  bool FCreateFrameManagers = true;
  bool FAllowNoSelection = false;
  bool FIgnoreRename = false;
  bool FClosing = false;
  bool FGeneratePreview = true;
  bool FInUndo = false;
  bool FResurrecting = false;

private:
  void CreateNewModule(const TCreateArgs& Args);
  /// The master of this view, or null on a master.
  [[nodiscard]] TComponentRoot* MasterOfView();
  /// Makes the root of view `Name`, read from `Stream`, from its file (`Existing`) or
  /// new, and appends it to the views; gives its index.
  int InternalAddView(const String& Name, bool Existing, const IPtr<IDatedStream>& Stream);
  /// The view list of the module record in a new string list.
  [[nodiscard]] TObjectGuard<TStringList> FetchViewList();
  /// The open descendants of a module back from dormancy follow its new root component.
  void RejoinDescendants();
  /// The last step of every creation: selects `Component`, shows it, marks the change.
  TComponent* SelectCreated(TComponent* Component);
  /// The root whose window a master shows: its active view, or itself.
  [[nodiscard]] TComponentRoot* ShownRoot();
  /// Raises the list's range error unless `Index` names a view.
  void CheckViewIndex(int Index) const;
  /// Reads the module from the stream given, or from its file.
  void ReadExistingModule(const TCreateArgs& Args);
  TComponent* CreateRootAs(const String& ClassName, const String& AncestorClassName, const IPtr<IRoot>& AncestorRoot);
  void SetCreateInfo(const String& AncestorClassName, const IPtr<IRoot>& AncestorRoot);
  TComponent* CreateRootInstance(const String& ClassName);
  void InternalInitializeDesigner(bool Resurrecting);
  void InternalDeinitializeDesigner(bool GoingDormant);
  void SelectionsChanged();
  void FreeRootStream() noexcept;
  bool IsModifiableFrame(TComponent* Component) const;
  void ValidateComponentRename(TComponent* Component, const String& CurName, const String& NewName);
  void ValidateRootRename(const String& CurName, const String& NewName);
  [[nodiscard]] IPtr<ICompInfo> NewCompInfo(TPersistent* Instance);
  /// Fills `FImportedRootList` from the host.
  void ImportRoots();
  /// Offers the names of `Root` and what it owns, as `GetComponentNames` walks them.
  void OfferNames(TComponent* Root, const String& Prefix, int Depth, bool IncludeRoot, TClass Wanted,
                  const TGetStrProc& Proc);
  /// Reads the method text of a paste after the reader's position, up to a zero byte.
  [[nodiscard]] static String ReadMethodText(TReader* Reader);
  void CheckFixups();
  void RevertComponents();
  /// Brings back the dormant modules that `Root`'s unresolved references name.
  void ResurrectDependentModules(TComponent* Root);
  /// The selected items of the surface, in selection order.
  [[nodiscard]] std::vector<IPtr<IItem>> SelectedItems();
  void CollectLinks(TComponent* Instance);
  [[nodiscard]] int WriteModuleFile(TStream* Image, int Stamp, int DiskAge);
  void RenameModuleFile(const String& OldName, const String& NewName);
  void ClearLinksOf(TComponent* Instance, TComponent* Gone);
  void FreeUndoStream() noexcept;
  /// Raises "`Service` is not available" when the generated classes are not there.
  static void RequireClassMethods(const char* Service);
  static const char* const AddingMethod;
};

} // namespace formkit
