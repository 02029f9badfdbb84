//===- tests/fakes/FakeDesigner.h - A framework designer for tests -------===//
//
// A concrete `TComponentDesigner` with the framework's part made of plain
// answers: its roots are `TFakeRoot`s added by the test, its extension and
// plain module class are fields, and it serves root classes descending from
// `ServedBase`. File operations are refused: the fake has no files.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesigner.h"
#include "tests/fakes/FakeRoot.h"

namespace formkit::fakes {

class TFakeDesigner : public TComponentDesigner {
  FK_CLASS(TFakeDesigner, TComponentDesigner)

  TFakeDesigner(const IPtr<IDesignEnvironment>& Environment, String Extension, TClass ServedBase)
      : TComponentDesigner(Environment), FExtension(std::move(Extension)), FServedBase(ServedBase) {}

  TClass DataModuleClass = nullptr;

  /// Makes a fake root, adds it to the root list as a framework's root constructor does.
  IPtr<TFakeRoot> AddRoot(const String& Name, TCallLog* Log) {
    IPtr<TFakeRoot> Root = New<TFakeRoot>(Name, Log);
    RootListAdd(QueryAs<IRoot>(InterfaceOf<IInternalRoot>(Root.Get())));
    return Root;
  }

  IPtr<IRoot> CreateRoot(const IPtr<IDesignerModule>&, const String&, bool, const String&, const String&,
                         const String&, const IPtr<IRoot>&, const String&) override {
    return nullptr;
  }
  IPtr<IRoot> CreateRootFromStream(const IPtr<IDesignerModule>&, const String&, const String&,
                                   const IPtr<IDatedStream>&, const IPtr<IRoot>&, const String&) override {
    return nullptr;
  }
  String GetDesignerName() override { return "Fake"; }
  String GetDesignerExtension() override { return FExtension; }
  TClass GetDataModuleClass() override { return DataModuleClass; }
  TStream* OpenFile(const String&, const String& Name, int) override {
    throw EComponentDesignerException("No file " + Name);
  }
  int GetFileAge(const String&, const String&) override { return -1; }
  bool FileExists(const String&, const String&) override { return false; }
  bool RenameFile(const String&, const String&, const String&) override { return false; }
  void GetTempFileName(const String&, const String& Name, String& Temp) override { Temp = Name + ".tmp"; }
  void GetBackupFileName(const String&, const String& Name, String& Backup) override { Backup = Name + ".bak"; }
  bool IsFileReadOnly(const String&, const String&) override { return false; }
  bool DeleteFile(const String&, const String&) override { return false; }
  void FileWritten(const String&, TStream*) override {}
  bool SupportsRootClass(TClass RootClass) override { return FServedBase && RootClass->InheritsFrom(FServedBase); }

private:
  String FExtension;
  TClass FServedBase;
};

} // namespace formkit::fakes
