//===- tests/fakes/RecordingModule.h - A host module record that records --===//
//
// Implements the host's `IDesignerModule` (and `IOTAModule`, which a module
// record must also answer to): records every call; methods "in the source" are
// a list a test can fill; `CheckWritable` refuses while `ReadOnly` is set.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "tests/fakes/CallLog.h"

namespace formkit::fakes {

class TRecordingModule : public TInterfacedObject, public IDesignerModule, public IOTAModule {
  FK_CLASS(TRecordingModule, TInterfacedObject)
  FK_INTERFACES(IDesignerModule, IOTAModule)

  explicit TRecordingModule(String FileName = "Unit1.kfm", TCallLog* Log = nullptr)
      : FLog(Log ? Log : &FOwnLog), FFileName(std::move(FileName)) {}
  TCallLog& Log() { return *FLog; }

  // What the host answers.
  String ModuleIdentifier;
  String UnitName = "Unit1";
  bool ReadOnly = false;
  std::vector<String> SourceMethods;

  void Activate(bool) override { FLog->Add("Activate"); }
  void CreateMethod(const String& Name, const IPtr<IEventInfo>&) override {
    FLog->Add("CreateMethod(" + Name + ")");
    SourceMethods.push_back(Name);
  }
  void Modified() override { FLog->Add("Modified"); }
  String GetModuleIdentifier() override { return ModuleIdentifier; }
  String GetCompUnitName() override { return UnitName; }
  String GetAncestorClassName(const String&) override { return ""; }
  void GetMethods(const IPtr<IEventInfo>&, const TGetStrProc& Proc) override {
    for (const String& M : SourceMethods) Proc(M);
  }
  void GetAncestorMethods(const IPtr<IEventInfo>&, const TGetStrProc&) override {}
  bool IsMethodInherited(const String&) override { return false; }
  void ShowSource() override {}
  void ModuleResurrected() override { FLog->Add("ModuleResurrected"); }
  bool MethodExists(const String& Name, const IPtr<IEventInfo>&) override {
    for (const String& M : SourceMethods)
      if (SameText(M, Name)) return true;
    return false;
  }
  void RenameComponent(const TCompInfo&, const String& CurName, const String& NewName) override {
    FLog->Add("RenameComponent(" + CurName + "," + NewName + ")");
  }
  void ValidateComponentName(const TCompInfo&, const String& NewName) override {
    FLog->Add("ValidateComponentName(" + NewName + ")");
  }
  void RenameMethod(const String& CurName, const String& NewName) override {
    FLog->Add("RenameMethod(" + CurName + "," + NewName + ")");
  }
  void ShowMethod(const String& Name) override { FLog->Add("ShowMethod(" + Name + ")"); }
  void GetComponentNames(const TGetStrProc&) override {}
  void MakeComponentLinkable(const String& RootName) override { FLog->Add("MakeComponentLinkable(" + RootName + ")"); }
  void BeforeSave() override { FLog->Add("BeforeSave"); }
  void Notify(TNotifyCode Code) override { FLog->Add("Notify(" + GetEnumName(TypeInfo<TNotifyCode>(), Code) + ")"); }
  void ViewAsText() override { FLog->Add("ViewAsText"); }
  String GetMethodSource(const String& Name) override { return "procedure " + Name + ";\n"; }
  void InsertMethodSource(const String&, TStrings*, TStrings*) override { FLog->Add("InsertMethodSource"); }
  void GetProjectModules(const TGetModuleProc&) override {}
  bool GetReadOnly() override { return ReadOnly; }
  String GetUnitName() override { return UnitName; }
  void ChainCall(const String&, const String&, const String&, const IPtr<IEventInfo>&) override {}
  void Save() override { FLog->Add("Save"); }
  String GetFileName() override { return FFileName; }
  void CheckWritable() override {
    FLog->Add("CheckWritable");
    if (ReadOnly) throw EComponentDesignerException("The module is read-only");
  }
  void Close() override { FLog->Add("Close"); }

  // IOTAModule
  int GetModuleFileCount() override { return 1; }
  String GetModuleFileName(int) override { return FFileName; }

private:
  TCallLog FOwnLog;
  TCallLog* FLog;
  String FFileName;
};

} // namespace formkit::fakes
