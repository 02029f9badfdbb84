//===- tools/StringsFileSystem.h - String list properties as virtual files ===//
//
// A file system of its own that the host's code editor opens like any other:
// a file name "Designer.Root.Component.Property" stands for one string list
// property of one component of one designed module. Reading the file gives
// the list's text as UTF-8; writing it stores the text back into the list when
// the editor closes its stream, and marks the module as modified. An entry
// (`TActiveTStringsProperty`) keeps the open file in step with the component:
// renames change the file name, the component's end closes the file, a save of
// the form saves the file first.
//
// Example:
//   RegisterStringsFileSystem();                       // when the host arrives
//   IPtr<IStream> S = StringsFileSystem()->GetFileStream("Kiln.Form1.Memo1.Lines", fmCreate);
//   (void)S->Write(Text.data(), Text.size());
//   S = nullptr;                                       // the list takes the text now
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/IStreams.h"
#include "platform/Classes.h"
#include "platform/Lists.h"
#include "tools/ToolsAPI.h"

namespace formkit {

class TStringsFileSystem;

FK_RESOURCESTRING(SUnableToFindComponent, "Unable to locate form/component, '%s'");
FK_RESOURCESTRING(SCantFindProperty, "Unable to locate property '%s' on component '%s'");
FK_RESOURCESTRING(SStringsPropertyInvalid, "Property '%s' has not been initialized on component '%s'");

/// The identifier the file system is registered under.
inline constexpr const char* StringsFileSystemID = "Tessel.TStringsFileSystem";

//===----------------------------------------------------------------------===//
// File names and dates
//===----------------------------------------------------------------------===//

/// The four parts of a virtual file name.
struct TStringsFileName {
  String Designer, Root, Component, Property;
};

/// "Designer.Root.Component.Property".
FK_API String MakeStringsFileName(const String& Designer, const String& Root, const String& Component,
                                  const String& Property);
/// The parts of `FileName` after its directory is cut: only the first three points
/// split, the property is the rest. Missing parts are empty.
FK_API TStringsFileName SplitStringsFileName(const String& FileName);
/// The name of the designer that edits `Designer`'s module, as file names carry it;
/// empty when no registered designer has the module's extension.
FK_API String StringsDesignerName(const IPtr<IDesigner>& Designer);

/// `Value` as a packed local file date (seconds halved, years from 1980); 0 before 1980.
FK_API int DateTimeToFileDate(TDateTime Value) noexcept;

//===----------------------------------------------------------------------===//
// One open property
//===----------------------------------------------------------------------===//

class TActiveTStringsProperty;

/// The base of the entry's notifiers: the host dropping the subject frees the entry.
class FK_API TOTANotifier : public TNotifierObject {
  FK_CLASS(TOTANotifier, TNotifierObject)

  explicit TOTANotifier(TActiveTStringsProperty* Owner = nullptr) : FOwner(Owner) {}
  void Destroyed() override;
  /// The entry goes: a host that still holds the notifier reaches nothing through it.
  void Detach() noexcept { FOwner = nullptr; }

protected:
  /// The entry; a plain back reference, the entry holds the notifier.
  TActiveTStringsProperty* FOwner;
};

/// Watches the module of the virtual file.
class FK_API TOTAModuleNotifier : public TOTANotifier, public IOTAModuleNotifier {
  FK_CLASS(TOTAModuleNotifier, TOTANotifier)
  FK_INTERFACES(IOTAModuleNotifier)
  using TOTANotifier::TOTANotifier;

  void AfterSave() override { TOTANotifier::AfterSave(); }
  void BeforeSave() override { TOTANotifier::BeforeSave(); }
  void Destroyed() override { TOTANotifier::Destroyed(); }
  void Modified() override {}
  bool CheckOverwrite() override { return true; }
  /// A module saved under a real name leaves the file system, and the entry goes.
  void ModuleRenamed(const String& NewName) override;
};

/// Watches the form the component lives on.
class FK_API TOTAFormNotifier : public TOTANotifier, public IOTAFormNotifier {
  FK_CLASS(TOTAFormNotifier, TOTANotifier)
  FK_INTERFACES(IOTAFormNotifier)
  using TOTANotifier::TOTANotifier;

  void AfterSave() override { TOTANotifier::AfterSave(); }
  void BeforeSave() override { TOTANotifier::BeforeSave(); }
  void Destroyed() override { TOTANotifier::Destroyed(); }
  void Modified() override { TOTANotifier::Modified(); }
  void FormActivated() override {}
  /// Saves the virtual file first, so that an edit in progress reaches the property.
  void FormSaving() override;
  /// The file name follows a rename of the component or of its root.
  void ComponentRenamed(TOTAHandle ComponentHandle, const String& OldName, const String& NewName) override;
};

/// One property open as a virtual file, owned by the application object. Holds the
/// host's module of the file and the form editor of the component's module, each with
/// a notifier registered; lives until the module goes, leaves the file system or the
/// component dies. Its place in the file system's list is found by the object, so that
/// it stays right as other entries go.
class FK_API TActiveTStringsProperty : public TComponent {
  FK_CLASS(TActiveTStringsProperty, TComponent)
  friend class TStringsFileSystem;

  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  TComponent* Component() const noexcept { return FComponent; }
  /// Moves the free notification and the form notifier to `AComponent`'s form.
  void SetComponent(TComponent* AComponent);
  const String& PropertyName() const noexcept { return FPropertyName; }
  const IPtr<IOTAModule>& Module() const noexcept { return FModule; }
  /// Moves the module notifier to `AModule`.
  void SetModule(const IPtr<IOTAModule>& AModule);
  /// The packed file date last stored; 0 at first.
  int DiskAge() const noexcept { return FDiskAge; }
  void SetDiskAge(int Value) noexcept { FDiskAge = Value; }
  /// A rename of the component or its root: the file name follows; another rename
  /// changes nothing.
  void RenameComponent(const String& AOldName, const String& ANewName);

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  void DetachFormNotifier() noexcept;

  TComponent* FComponent = nullptr;
  String FPropertyName;
  IPtr<IOTAModule> FModule;
  IPtr<IOTAFormEditor> FFormEditor;
  IPtr<IOTAModuleNotifier> FModuleNotifier;
  IPtr<IOTAFormNotifier> FFormModuleNotifier;
  int FModuleNotifierIndex = -1;
  int FFormNotifierIndex = -1;
  int FDiskAge = 0;
};

//===----------------------------------------------------------------------===//
// The stream
//===----------------------------------------------------------------------===//

/// The content of one virtual file while the host holds it: a memory stream filled
/// with the list's text, which goes back into the list when the stream goes, if it was
/// written to. Its modification time follows the writes.
class FK_API TStringsStream : public TIMemoryStream, public IOTAStreamModifyTime {
  FK_CLASS(TStringsStream, TIMemoryStream)
  FK_INTERFACES(IOTAStreamModifyTime)

  /// The list behind `AComponent`'s property `APropertyName`. Raises `ENonAIRException`
  /// when the component has no such property or it holds no list.
  [[nodiscard]] static TStrings* StringsOf(TComponent* AComponent, const String& APropertyName);
  /// A stream over `AList` of `AComponent`, which `StringsOf` found; `fmCreate` starts
  /// it empty, another mode with the list's text. Its time is the entry's stored date.
  TStringsStream(TActiveTStringsProperty* AActive, TComponent* AComponent, TStrings* AList, int AMode);
  void BeforeDestruction() override;

  /// A write of at least one byte counts as a change.
  [[nodiscard]] std::int64_t Write(const void* Buffer, std::int64_t Count) override;
  int GetModifyTime() override { return FModifyTime; }
  void SetModifyTime(int Time) override { FModifyTime = Time; }

private:
  /// Whether the entry and the component are still there: either may go while the host
  /// holds the stream.
  bool TargetAlive() const;
  void StoreText() noexcept;

  TComponent* FComponent;
  TStrings* FStringsProperty = nullptr;
  TActiveTStringsProperty* FActiveTStringsProperty;
  bool FModified = false;
  int FModifyTime = 0;
};

//===----------------------------------------------------------------------===//
// The file system
//===----------------------------------------------------------------------===//

/// The virtual file system of string list properties. One instance, made by
/// `RegisterStringsFileSystem`; its list names the open entries but does not own them.
class FK_API TStringsFileSystem : public TInterfacedObject, public IOTAFileSystem {
  FK_CLASS(TStringsFileSystem, TInterfacedObject)
  FK_INTERFACES(IOTAFileSystem)
  friend class TActiveTStringsProperty;

  TStringsFileSystem();
  void BeforeDestruction() override;

  /// A stream over the property's text. Raises `ENonAIRException` when the name does not
  /// resolve to a component, or the property holds no list.
  IPtr<IStream> GetFileStream(const String& FileName, int Mode) override;
  /// The entry's stored date; -1 for a name never opened.
  int FileAge(const String& FileName) override;
  bool RenameFile(const String&, const String&) override { return true; }
  bool IsReadonly(const String&) override { return false; }
  bool IsFileBased() override { return false; }
  bool DeleteFile(const String&) override { return true; }
  /// True when the name resolves to a component; may ask the host to open the module.
  bool FileExists(const String& FileName) override;
  String GetTempFileName(const String& FileName) override { return FileName; }
  String GetBackupFileName(const String& FileName) override { return FileName; }
  String GetIDString() override { return StringsFileSystemID; }

  /// The entry of `AFileName`, made for `AComponent`'s property when there is none; the
  /// host's module of that name becomes the entry's.
  TActiveTStringsProperty* GetTStringsProperty(const String& AFileName, TComponent* AComponent,
                                               const String& APropertyName);
  /// The number of open entries.
  int Count() const { return FActiveTStringsProperties->Count(); }
  /// The file name of entry `Index`.
  String FileName(int Index) const { return FActiveTStringsProperties->Get(Index); }
  /// The index of `Entry`, or -1 when it is not (or no longer) open.
  int IndexOf(const TActiveTStringsProperty* Entry) const { return FActiveTStringsProperties->IndexOfObject(Entry); }

private:
  TObjectGuard<TStringList> FActiveTStringsProperties;
};

/// The registered file system, or null.
FK_API TStringsFileSystem* StringsFileSystem() noexcept;
/// Registers the file system with the host's module services; nothing when it is
/// registered already or the host offers no module services.
FK_API void RegisterStringsFileSystem();
/// Removes the file system from the host's module services.
FK_API void UnregisterStringsFileSystem();

} // namespace formkit
