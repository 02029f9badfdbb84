//===- tests/frameworks/kiln/design/StringsHost.h - A host with a code editor ===//
//
// The host's module services as the strings file system and the string
// editors meet them: file systems registered by index, text modules created
// from a creator and read through their file system as a code editor does,
// form modules with a form editor whose notifiers a test can fire, and every
// call recorded in the log ("Show(Kiln.Form1.Memo1.Lines)", "CloseModule",
// ...). A text module holds its text as the code editor's buffer: `Load` reads
// it through the file system, `SaveBuffer` writes it back.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "tests/fakes/CallLog.h"
#include "tools/StringsFileSystem.h"

#include <vector>

namespace formkit::fakes {

class TStringsHostModule;

/// The editor of a host module: a text buffer or a form.
class TStringsHostEditor : public TInterfacedObject, public IOTAFormEditor, public INTAFormEditor {
  FK_CLASS(TStringsHostEditor, TInterfacedObject)
  FK_INTERFACES(IOTAFormEditor, INTAFormEditor)

  TStringsHostEditor(TStringsHostModule* Module, TCallLog* Log, IPtr<IDesigner> Designer)
      : FModule(Module), FLog(Log), FDesigner(std::move(Designer)) {}

  bool Modified = false;
  /// The notifiers registered, by handle; a removed one is null.
  std::vector<IPtr<IOTANotifier>> Notifiers;

  /// Tells the form notifiers of a rename, as the form does after it.
  void FireRenamed(TComponent* Component, const String& OldName, const String& NewName) {
    for (size_t I = 0; I < Notifiers.size(); ++I)
      if (auto Form = QueryAs<IOTAFormNotifier>(Notifiers[I])) Form->ComponentRenamed(Component, OldName, NewName);
  }
  void FireSaving() {
    for (size_t I = 0; I < Notifiers.size(); ++I)
      if (auto Form = QueryAs<IOTAFormNotifier>(Notifiers[I])) Form->FormSaving();
  }
  int LiveNotifiers() const {
    int Count = 0;
    for (const auto& N : Notifiers) Count += N ? 1 : 0;
    return Count;
  }

  int AddNotifier(const IPtr<IOTANotifier>& Notifier) override {
    Notifiers.push_back(Notifier);
    return static_cast<int>(Notifiers.size()) - 1;
  }
  void RemoveNotifier(int Index) override { Notifiers.at(static_cast<size_t>(Index)) = nullptr; }
  String GetFileName() override;
  bool GetModified() override { return Modified; }
  IPtr<IOTAModule> GetModule() override;
  bool MarkModified() override {
    FLog->Add("MarkModified(" + GetFileName() + ")");
    Modified = true;
    return true;
  }
  void Show() override { FLog->Add("Show(" + GetFileName() + ")"); }
  IPtr<IOTAComponent> GetRootComponent() override { return nullptr; }
  IPtr<IOTAComponent> FindComponent(const String&) override { return nullptr; }
  IPtr<IOTAComponent> GetComponentFromHandle(TOTAHandle) override { return nullptr; }
  int GetSelCount() override { return 0; }
  IPtr<IOTAComponent> GetSelComponent(int) override { return nullptr; }
  IPtr<IOTAComponent> GetCreateParent() override { return nullptr; }
  IPtr<IOTAComponent> CreateComponent(const IPtr<IOTAComponent>&, const String&, int, int, int, int) override {
    return nullptr;
  }
  void GetFormResource(const IPtr<IStream>&) override {}
  IPtr<IDesigner> GetFormDesigner() override { return FDesigner; }
  void GetFormResource(TStream*) override {}

private:
  TStringsHostModule* FModule; // the module holds its editors
  TCallLog* FLog;
  IPtr<IDesigner> FDesigner;
};

class TStringsHostServices;

/// A module of the host: a text module over a file system, or a form module.
class TStringsHostModule : public TInterfacedObject, public IOTAModule {
  FK_CLASS(TStringsHostModule, TInterfacedObject)
  FK_INTERFACES(IOTAModule)

  TStringsHostModule(TStringsHostServices* Services, String FileName, String FileSystem, TCallLog* Log,
              IPtr<IDesigner> Designer = nullptr)
      : FileName(std::move(FileName)), FileSystem(std::move(FileSystem)), FServices(Services), FLog(Log) {
    Editor = New<TStringsHostEditor>(this, Log, std::move(Designer));
  }
  void BeforeDestruction() override {
    Editor = nullptr;
    inherited::BeforeDestruction();
  }

  String FileName;
  String FileSystem;
  /// The code editor's buffer.
  String Buffer;
  IPtr<TStringsHostEditor> Editor;
  std::vector<IPtr<IOTAModuleNotifier>> Notifiers;

  /// Reads the buffer through the module's file system, as the code editor opens a file.
  void Load();
  /// Writes the buffer through the file system, as the code editor saves.
  void SaveBuffer();

  String GetFileName() override { return FileName; }
  int GetModuleFileCount() override { return 1; }
  String GetModuleFileName(int) override { return FileName; }
  int AddNotifier(const IPtr<IOTAModuleNotifier>& Notifier) override {
    Notifiers.push_back(Notifier);
    return static_cast<int>(Notifiers.size()) - 1;
  }
  void RemoveNotifier(int Index) override { Notifiers.at(static_cast<size_t>(Index)) = nullptr; }
  IPtr<IOTAEditor> GetModuleFileEditor(int) override { return IPtr<IOTAFormEditor>(Editor.Get()); }
  bool Save(bool, bool) override {
    FLog->Add("Save(" + FileName + ")");
    SaveBuffer();
    return true;
  }
  /// Closes the module: its notifiers hear `Destroyed`, the services forget it.
  bool CloseModule(bool Force) override;
  /// Saving under another name: the notifiers hear of it.
  void SetFileName(const String& Name) override {
    FLog->Add("SetFileName(" + Name + ")");
    FileName = Name;
  }
  void SetFileSystem(const String& Name) override {
    FLog->Add("SetFileSystem(" + Name + ")");
    FileSystem = Name;
  }
  /// The user saved the module under `Name`.
  void SaveAs(const String& Name) {
    FileName = Name;
    for (size_t I = 0; I < Notifiers.size(); ++I)
      if (IPtr<IOTAModuleNotifier> N = Notifiers[I]) N->ModuleRenamed(Name);
  }
  int LiveNotifiers() const {
    int Count = 0;
    for (const auto& N : Notifiers) Count += N ? 1 : 0;
    return Count;
  }

private:
  TStringsHostServices* FServices; // the services hold their modules
  TCallLog* FLog;
};

/// The host's module services and file systems.
class TStringsHostServices : public TInterfacedObject, public IHalvernIDEServices, public IOTAModuleServices {
  FK_CLASS(TStringsHostServices, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTAModuleServices)

  explicit TStringsHostServices(TCallLog* Log) : FLog(Log) {}

  std::vector<IPtr<IOTAFileSystem>> FileSystems;
  std::vector<IPtr<TStringsHostModule>> Modules;
  /// When set, `CreateModule` creates nothing.
  bool RefuseModules = false;

  /// A form module of `RootName` whose editor answers with `Designer`.
  IPtr<TStringsHostModule> AddFormModule(const String& RootName, const IPtr<IDesigner>& Designer) {
    Modules.push_back(New<TStringsHostModule>(this, RootName, "", FLog, Designer));
    return Modules.back();
  }
  IPtr<TStringsHostModule> Find(const String& FileName) {
    for (const auto& M : Modules)
      if (AnsiCompareFileName(M->FileName, FileName) == 0) return M;
    return nullptr;
  }
  IPtr<IOTAFileSystem> FileSystemOf(const String& Id) {
    for (const auto& F : FileSystems)
      if (F && F->GetIDString() == Id) return F;
    return nullptr;
  }
  void Forget(TStringsHostModule* Module) {
    for (size_t I = 0; I < Modules.size(); ++I)
      if (Modules[I].Get() == Module) {
        Modules.erase(Modules.begin() + static_cast<std::ptrdiff_t>(I));
        return;
      }
  }

  int AddFileSystem(const IPtr<IOTAFileSystem>& FileSystem) override {
    FLog->Add("AddFileSystem(" + FileSystem->GetIDString() + ")");
    FileSystems.push_back(FileSystem);
    return static_cast<int>(FileSystems.size()) - 1;
  }
  void RemoveFileSystem(int Index) override {
    FLog->Add("RemoveFileSystem(" + IntToStr(Index) + ")");
    FileSystems.at(static_cast<size_t>(Index)) = nullptr;
  }
  /// Opens a text module as the creator describes it; its buffer is the creator's source.
  IPtr<IOTAModule> CreateModule(const IPtr<IOTACreator>& Creator) override {
    auto ModuleCreator = QueryAs<IOTAModuleCreator>(Creator);
    FLog->Add("CreateModule(" + Creator->GetCreatorType() + "," + ModuleCreator->GetImplFileName() + "," +
              Creator->GetFileSystem() + ")");
    if (RefuseModules) return nullptr;
    auto Module = New<TStringsHostModule>(this, ModuleCreator->GetImplFileName(), Creator->GetFileSystem(), FLog);
    Module->Buffer = ModuleCreator->NewImplSource("", "", "")->GetSource();
    Modules.push_back(Module);
    return IPtr<IOTAModule>(Module.Get());
  }
  IPtr<IOTAModule> FindModule(const String& FileName) override {
    IPtr<TStringsHostModule> M = Find(FileName);
    return M ? IPtr<IOTAModule>(M.Get()) : nullptr;
  }
  int GetModuleCount() override { return static_cast<int>(Modules.size()); }
  IPtr<IOTAModule> GetModule(int Index) override {
    return IPtr<IOTAModule>(Modules.at(static_cast<size_t>(Index)).Get());
  }
  IPtr<IOTAProjectGroup> GetMainProjectGroup() override { return nullptr; }
  IPtr<IOTAProject> GetActiveProject() override { return nullptr; }

private:
  TCallLog* FLog;
};

inline String TStringsHostEditor::GetFileName() { return FModule->FileName; }
inline IPtr<IOTAModule> TStringsHostEditor::GetModule() { return IPtr<IOTAModule>(FModule); }

inline void TStringsHostModule::Load() {
  IPtr<IStream> Stream = FServices->FileSystemOf(FileSystem)->GetFileStream(FileName, fmOpenRead | fmShareDenyNone);
  Buffer.clear();
  char Chunk[256];
  while (std::int64_t Read = Stream->Read(Chunk, sizeof Chunk)) Buffer.append(Chunk, static_cast<size_t>(Read));
}

inline void TStringsHostModule::SaveBuffer() {
  IPtr<IOTAFileSystem> Files = FServices->FileSystemOf(FileSystem);
  if (!Files) return;
  IPtr<IStream> Stream = Files->GetFileStream(FileName, fmCreate);
  (void)Stream->Write(Buffer.data(), static_cast<std::int64_t>(Buffer.size()));
}

inline bool TStringsHostModule::CloseModule(bool Force) {
  FLog->Add(String("CloseModule(") + (Force ? "force" : "ask") + ")");
  IPtr<TStringsHostModule> Self(this);
  for (size_t I = 0; I < Notifiers.size(); ++I)
    if (IPtr<IOTAModuleNotifier> N = Notifiers[I]) N->Destroyed();
  FServices->Forget(this);
  return true;
}

} // namespace formkit::fakes
