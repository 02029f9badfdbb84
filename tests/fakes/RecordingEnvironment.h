//===- tests/fakes/RecordingEnvironment.h - A host environment that records -===//
//
// Implements the host's `IDesignEnvironment`: records every call in a log and
// answers from fields a test sets (options, time stamps, the picked tool).
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "tests/fakes/CallLog.h"

#include <functional>

namespace formkit::fakes {

class TRecordingEnvironment : public TInterfacedObject, public IDesignEnvironment, public IDesignLocalMenu {
  FK_CLASS(TRecordingEnvironment, TInterfacedObject)
  FK_INTERFACES(IDesignEnvironment, IDesignLocalMenu)

  /// The host's menu layer building a module's local menu; unset, there is none.
  std::function<IPtr<IPopupMenu>(TLocalMenuTypes)> LocalMenu;
  IPtr<IPopupMenu> BuildLocalMenu(TLocalMenuTypes Filter) override { return LocalMenu ? LocalMenu(Filter) : nullptr; }

  explicit TRecordingEnvironment(TCallLog* Log = nullptr) : FLog(Log ? Log : &FOwnLog) {}
  TCallLog& Log() { return *FLog; }

  // What the host answers.
  TDesignerOptions Options;
  int Timestamp = 1000;
  IPtr<IOTABasePaletteItem> ToolSelected;
  std::function<void(const String& Name)> OnOpenModuleByName;
  std::function<TComponent*(const String& Name)> GlobalComponents;
  bool CreateBackups = false;
  /// What `GetShiftState` answers: the keys and buttons a test holds down.
  TShiftState ShiftState;

  void ActiveRootModified() override { FLog->Add("ActiveRootModified"); }
  void ComponentRenamed(const String& CurName, const String& NewName) override {
    FLog->Add("ComponentRenamed(" + CurName + "," + NewName + ")");
  }
  TComponent* FindGlobalComponent(const String& Name) override {
    FLog->Add("FindGlobalComponent(" + Name + ")");
    return GlobalComponents ? GlobalComponents(Name) : nullptr;
  }
  void Dialog(TDesignDialog Kind) override { FLog->Add("Dialog(" + GetEnumName(TypeInfo<TDesignDialog>(), Kind) + ")"); }
  void ActiveRootChanged() override { FLog->Add("ActiveRootChanged"); }
  void ShowObjectInspector() override { FLog->Add("ShowObjectInspector"); }
  String GetPathAndBaseExeName() override { return "/opt/host/bin/host"; }
  String GetPrivateDirectory() override { return "/home/user/.host"; }
  String GetAppDataDirectory(bool Local) override { return Local ? "/home/user/.local/host" : "/home/user/.host"; }
  String GetIDEVersion() override { return "1.0"; }
  String GetBaseRegKey() override { return "Software\\Host"; }
  IPtr<IInterface> GetIDEOptions() override { return nullptr; }
  bool IsIDEBusy() override { return false; }
  void GetToolSelected(IPtr<IOTABasePaletteItem>& Item) override { Item = ToolSelected; }
  void GetPaletteItem(TClass, IPtr<IOTABasePaletteItem>& Item) override { Item = nullptr; }
  int GetTimestamp() override { return ++Timestamp; }
  void GetDesignerOptions(TDesignerOptions& Out) override { Out = Options; }
  void GetMainWindowSize(TRect& Rect) override { Rect = {0, 0, 1024, 120}; }
  void ShowPalette() override {}
  void ShowStructureView() override {}
  void RefreshInspector() override {}
  TClass FindComponentClass(const String& Name) override {
    FLog->Add("FindComponentClass(" + Name + ")");
    return nullptr;
  }
  void EnsureClassAvailable(const String& Name, const IPtr<IComponentDesigner>&) override {
    FLog->Add("EnsureClassAvailable(" + Name + ")");
  }
  void ModalEdit(char, const IPtr<IActivatable>&) override { FLog->Add("ModalEdit"); }
  void OpenModuleByName(const String& Name, const IPtr<IInterface>&) override {
    FLog->Add("OpenModuleByName(" + Name + ")");
    if (OnOpenModuleByName) OnOpenModuleByName(Name);
  }
  void ToolUsed() override { FLog->Add("ToolUsed"); }
  void SelectionChanged() override { FLog->Add("SelectionChanged"); }
  void SelectItemName(const String& Name) override { FLog->Add("SelectItemName(" + Name + ")"); }
  void RefreshPalette() override {}
  bool GetCreateBackups() override { return CreateBackups; }
  String GetDesktopName() override { return "Default"; }
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent* Item) override {
    FLog->Add("ItemDeleted(" + (Item ? Item->GetNamePath() : String("nil")) + ")");
  }
  TShiftState GetShiftState() override { return ShiftState; }

private:
  TCallLog FOwnLog;
  TCallLog* FLog;
};

} // namespace formkit::fakes
