//===- host/DesignHost.h - A design host over files -----------------------===//
//
// The host's side of the design contract for programs that design modules kept
// in files: `THostEnvironment` answers what the core asks of an IDE (options,
// the palette's tool, time stamps, opening a module by name), `THostModule` is
// the record of one module with its source file beside it, and `TDesignSession`
// starts the core with the Kiln designer, opens, creates, saves and closes
// modules, and stops everything again. Each class has defaults an embedder can
// override.
//
// Example:
//   TDesignSession Session;                        // the core and the Kiln designer
//   IPtr<IRoot> Form = Session.Open("Form1.kfm");  // its ancestor opens too
//   Session.Designer(Form)->SelectComponent(Form->GetRoot()->FindComponent("Button1"));
//   Session.Save(Form);                            // the form file and its source
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "core/ToolServices.h"
#include "core/root/ComponentRoot.h"
#include "host/ModuleSource.h"

#include <memory>

namespace formkit {

FK_EXCEPTION(EHostError, Exception);
/// What the host raises for a module, component, property, class or file it does not find.
FK_EXCEPTION(EHostNotFound, EHostError);

FK_RESOURCESTRING(sFileExists, "%s exists already");

class TDesignSession;

//===----------------------------------------------------------------------===//
// The environment
//===----------------------------------------------------------------------===//

/// What the core asks of the host. Does not own the session it opens modules through.
class FK_API THostEnvironment : public TInterfacedObject, public IDesignEnvironment {
  FK_CLASS(THostEnvironment, TInterfacedObject)
  FK_INTERFACES(IDesignEnvironment)
  THostEnvironment() = default;
  explicit THostEnvironment(TDesignSession* Session) : FSession(Session) {}

  /// The designer's options: an 8-pixel grid that controls snap to, guidelines on.
  TDesignerOptions Options = DefaultOptions();
  /// Whether a save keeps the last file as a backup.
  bool CreateBackups = true;
  /// The class the palette has armed for creation; null for none.
  TClass ToolClass = nullptr;
  /// The keys and buttons held now.
  TShiftState ShiftState;
  static TDesignerOptions DefaultOptions();

  // IDesignEnvironment
  void ActiveRootModified() override {}
  void ComponentRenamed(const String&, const String&) override {}
  TComponent* FindGlobalComponent(const String&) override { return nullptr; }
  void Dialog(TDesignDialog) override {}
  void ActiveRootChanged() override {}
  void ShowObjectInspector() override {}
  String GetPathAndBaseExeName() override { return "formkit"; }
  String GetPrivateDirectory() override;
  String GetAppDataDirectory(bool Local) override;
  String GetIDEVersion() override;
  String GetBaseRegKey() override { return "Software\\formkit"; }
  IPtr<IInterface> GetIDEOptions() override { return nullptr; }
  bool IsIDEBusy() override { return false; }
  /// A palette entry for `ToolClass`.
  void GetToolSelected(IPtr<IOTABasePaletteItem>& Item) override;
  void GetPaletteItem(TClass ComponentClass, IPtr<IOTABasePaletteItem>& Item) override;
  /// A counter that only grows: each change of a module gets its own stamp.
  int GetTimestamp() override { return ++FStamp; }
  void GetDesignerOptions(TDesignerOptions& Out) override { Out = Options; }
  void GetMainWindowSize(TRect& Rect) override { Rect = {0, 0, 1280, 120}; }
  void ShowPalette() override {}
  void ShowStructureView() override {}
  void RefreshInspector() override {}
  /// Registered classes by name.
  TClass FindComponentClass(const String& Name) override { return GetClass(Name); }
  void EnsureClassAvailable(const String&, const IPtr<IComponentDesigner>&) override {}
  void ModalEdit(char, const IPtr<IActivatable>&) override {}
  /// Opens `Name`.kfm from the session's directories.
  void OpenModuleByName(const String& Name, const IPtr<IInterface>& Root) override;
  /// A creation used the armed tool: the palette goes back to the arrow.
  void ToolUsed() override { ToolClass = nullptr; }
  void SelectionChanged() override {}
  void SelectItemName(const String&) override {}
  void RefreshPalette() override {}
  bool GetCreateBackups() override { return CreateBackups; }
  String GetDesktopName() override { return "Default"; }
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  TShiftState GetShiftState() override { return ShiftState; }

private:
  TDesignSession* FSession = nullptr; // not owned: the session owns this environment
  int FStamp = 0;
};

//===----------------------------------------------------------------------===//
// A module's record
//===----------------------------------------------------------------------===//

/// The host's record of one module: its file name and the source file beside it
/// (`.fks`), which follows the designer's renames and handlers and is written with the
/// module.
class FK_API THostModule : public TInterfacedObject, public IDesignerViewModule {
  FK_CLASS(THostModule, TInterfacedObject)
  FK_INTERFACES(IDesignerViewModule)
  THostModule() = default;
  /// Reads the source beside `FileName`, if there is one.
  explicit THostModule(const String& FileName);

  /// The source file's name: the module's with the extension ".fks".
  [[nodiscard]] String SourceFileName() const;
  TModuleSource& Source() noexcept { return FSource; }
  const TModuleSource& Source() const noexcept { return FSource; }
  /// The class the source says the module's class descends from.
  const String& SourceAncestor() const noexcept { return FSource.AncestorClass; }
  /// The module file moved: the source goes beside it at the next save.
  void SetFileName(const String& FileName) { FFileName = FileName; }
  /// Writes the source file; raises `ESourceFileError` when it cannot.
  void SaveSource() const { FSource.Save(SourceFileName()); }
  /// Whether the module file may not be written.
  bool ReadOnly = false;
  /// Whether a field of that name is declared by the ancestors' sources: the names a
  /// descendant takes over from its ancestor are not its own fields. Unset: none is.
  std::function<bool(const String& Field)> InheritedField;

  // IDesignerModule
  void Activate(bool) override {}
  /// Adds the handler to the source; refuses a name that is no identifier.
  void CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) override;
  void Modified() override { FModified = true; }
  String GetModuleIdentifier() override { return ""; }
  String GetCompUnitName() override { return GetUnitName(); }
  /// The ancestor the source declares; empty for a module of a base class.
  String GetAncestorClassName(const String& ClassName) override;
  void GetMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) override;
  void GetAncestorMethods(const IPtr<IEventInfo>&, const TGetStrProc&) override {}
  bool IsMethodInherited(const String&) override { return false; }
  void ShowSource() override {}
  void ModuleResurrected() override {}
  bool MethodExists(const String& Name, const IPtr<IEventInfo>& EventInfo) override;
  void RenameComponent(const IPtr<ICompInfo>& Info, const String& CurName, const String& NewName) override;
  /// Refuses a name that is no identifier.
  void ValidateComponentName(const IPtr<ICompInfo>& Info, const String& NewName) override;
  /// Refuses a name that is no identifier.
  void RenameMethod(const String& CurName, const String& NewName) override;
  void ShowMethod(const String&) override {}
  void GetComponentNames(const TGetStrProc&) override {}
  void MakeComponentLinkable(const String&) override {}
  void BeforeSave() override {}
  void Notify(TNotifyCode) override {}
  void ViewAsText() override {}
  String GetMethodSource(const String& Name) override { return FSource.MethodText(Name); }
  void InsertMethodSource(const String& Text, TStrings* Renames, TStrings* Inserted) override;
  void GetProjectModules(const TGetModuleProc&) override {}
  bool GetReadOnly() override { return ReadOnly; }
  /// The file's base name: "Form1" for "dir/Form1.kfm".
  String GetUnitName() override;
  void ChainCall(const String&, const String&, const String&, const IPtr<IEventInfo>&) override {}
  void Save() override {}
  String GetFileName() override { return FFileName; }
  /// Refuses while `ReadOnly`.
  void CheckWritable() override;
  void Close() override {}
  /// Whether the module changed since it was opened or last saved.
  bool IsModified() const noexcept { return FModified; }
  /// The module and its source were written.
  void MarkSaved() noexcept { FModified = false; }

  // IDesignerViewModule: the view list is kept in the source
  void GetViewNames(TStrings* Strings) override;
  void SetViewNames(TStrings* Strings) override;
  /// "Size": a view named after a device takes its size.
  void GetDeviceAttributeName(String& Name) override { Name = "Size"; }

private:
  String FFileName;
  TModuleSource FSource;
  bool FModified = false;
};

//===----------------------------------------------------------------------===//
// The session
//===----------------------------------------------------------------------===//

/// The core with the Kiln designer and this host, from construction to destruction;
/// one at a time in a process. Owns its environment and its modules' records; the
/// modules themselves are the designer's and are closed with the session.
class FK_API TDesignSession {
public:
  TDesignSession();
  ~TDesignSession();
  TDesignSession(const TDesignSession&) = delete;
  TDesignSession& operator=(const TDesignSession&) = delete;

  THostEnvironment& Environment() noexcept { return *FEnvironment.Get(); }
  const IPtr<IComponentDesigner>& ComponentDesigner() const noexcept { return FDesigner; }

  /// Opens the module file `Path`. Its ancestor and the modules it links to are
  /// opened from its directory. Raises what the read raises; nothing stays open then.
  IPtr<IRoot> Open(const String& Path);
  /// A new module of a form class named after the file ("Form3.kfm": Form3), inheriting
  /// from the open or openable module `AncestorName` when given.
  IPtr<IRoot> NewModule(const String& Path, const String& AncestorName = "");
  /// Writes the module file through the module's own `Save` (a master's views go along;
  /// a view saves its master), then its source.
  void Save(const IPtr<IRoot>& Root);
  /// Writes the module under another file name (its source goes along).
  void SaveAs(const IPtr<IRoot>& Root, const String& Path);
  void Close(const IPtr<IRoot>& Root);
  /// The open module named `Name` (its root's name, "Form1_Tall" for a view), or null.
  [[nodiscard]] IPtr<IRoot> Find(const String& Name) const;
  /// The open modules, in the order they were opened.
  const std::vector<IPtr<IRoot>>& Modules() const noexcept { return FModules; }
  /// The module's root on design.
  [[nodiscard]] static TComponentRoot* RootOf(const IPtr<IRoot>& Root);
  [[nodiscard]] THostModule* ModuleOf(const IPtr<IRoot>& Root) const;
  /// The directories `OpenModuleByName` looks in, the latest first.
  std::vector<String> SearchPath;

private:
  IPtr<IRoot> Track(IPtr<IRoot> Root, IPtr<THostModule> Module);
  [[nodiscard]] bool AncestorDeclares(const THostModule& Module, const String& Field) const;
  void Follow(THostModule* Module);

  IPtr<THostEnvironment> FEnvironment;
  IPtr<IComponentDesigner> FDesigner;
  std::vector<IPtr<IRoot>> FModules;
  std::vector<IPtr<THostModule>> FRecords;
};

} // namespace formkit
