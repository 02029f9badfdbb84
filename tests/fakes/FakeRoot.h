//===- tests/fakes/FakeRoot.h - A module on design for tests of designers -===//
//
// Answers to `IInternalRoot` and `IDesigner` the way a framework's root would,
// with the state a designer test needs: a root component, a module record, a
// selection, an active flag, a custom module, an ancestor, dormancy. Calls that
// matter to designers are recorded in the shared log as "<RootName>.<Call>".
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "tests/fakes/CallLog.h"

namespace formkit::fakes {

class TFakeRoot : public TInterfacedObject, public IInternalRoot, public IDesigner, public IOTAAlignable {
  FK_CLASS(TFakeRoot, TInterfacedObject)
  FK_INTERFACES(IInternalRoot, IDesigner, IOTAAlignable)

  TFakeRoot(String Name, TCallLog* Log) : FName(std::move(Name)), FLog(Log) {
    FRoot = CreateComponentOf<TComponent>(nullptr);
    FRoot->ChangeName(FName);
  }
  void BeforeDestruction() override {
    FreeAndNil(FRoot);
    inherited::BeforeDestruction();
  }

  // State a test sets or reads.
  std::vector<TPersistent*> Selected;
  IPtr<ICustomModule> CustomModule;
  IPtr<IDesignerModule> Module;
  IPtr<IRoot> Ancestor;
  IPtr<IRoot> Master;
  bool Dormant = false;
  bool Active = false;
  bool Locked = false;
  /// What `GetShiftState` answers: the keys and buttons a test holds down.
  TShiftState ShiftState;
  String FileName;
  TComponent* RootComponent() const { return FRoot; }
  void Record(const String& Call) { if (FLog) FLog->Add(FName + "." + Call); }

  // IFile
  bool CheckFileDate() override { return true; }
  IPtr<IDatedStream> FormFileOpen() override { return nullptr; }
  String GetFileName() override { return FileName.empty() ? FName + ".kfm" : FileName; }
  int GetModifyTime() override { return 0; }
  int GetTimeAtLoad() override { return 0; }
  void Rename(const String&) override {}
  void Save() override {}
  // IRoot
  void Close() override { Record("Close"); }
  IPtr<IDesignerModule> GetModule() override { return Module; }
  TComponent* GetRoot() override { return FRoot; }
  String GetRootName() override { return FName; }
  void Hide() override { Record("Hide"); }
  void GoDormant() override { Dormant = true; }
  void Show() override { Record("Show"); }
  void ShowHelp() override { Record("ShowHelp"); }
  IPtr<IDesigner> GetDesigner() override { return IPtr<IDesigner>(this); }
  IPtr<IRoot> GetActiveView() override { return nullptr; }
  int GetViewCount() override { return 0; }
  IPtr<IRoot> GetView(int) override { return nullptr; }
  String GetViewName(int) override { return ""; }
  int GetViewIndex(const String&) override { return -1; }
  IPtr<IRoot> GetMasterView() override { return Master; }
  int AddView(const String&) override { return -1; }
  void GetViewPreview(TPersistent*) override {}
  void GetViewPreview(const String&, TPersistent*) override {}
  void RemoveView(const String&) override {}
  void RemoveView(int) override {}
  // IInternalRoot
  void HideForModule() override { Record("HideForModule"); }
  void ShowForModule() override { Record("ShowForModule"); }
  TClass GetCustomModuleClass() override { return nullptr; }
  TClass GetRootBaseClass() override { return TComponent::StaticClass(); }
  TClass GetRootClass() override { return FRoot->ClassType(); }
  IPtr<ICustomModule> GetCustomModule() override { return CustomModule; }
  IPtr<IUpdateManager> GetUpdateManager() override { return nullptr; }
  TObject* Implementor() override { return this; }
  bool IsDormant() override { return Dormant; }
  void ModifiedUpdateNotification() override {}
  void PasteSelectionFromStream(TStream*, TComponent*, const TRect&) override { Record("PasteSelectionFromStream"); }
  void RemoveDependenciesOn(TComponent*) override { Record("RemoveDependenciesOn"); }
  void Resurrect() override {
    Dormant = false;
    Record("Resurrect");
  }
  void SetActive(bool Value) override {
    Active = Value;
    Record(Value ? "SetActive(True)" : "SetActive(False)");
  }
  void SetControlsLocked(bool Value) override { Locked = Value; }
  void UpdateDependencies() override { Record("UpdateDependencies"); }
  void UpdateOptions() override { Record("UpdateOptions"); }
  void SetActiveView(const IPtr<IRoot>&) override {}
  IPtr<IRoot> GetAncestorRoot() override { return Ancestor; }
  /// Serves both the root's and the designer's `GetSelections`.
  void GetSelections(const IPtr<IDesignerSelections>& List) override {
    for (TPersistent* P : Selected) List->Add(P);
  }
  void CancelModes() override { Record("CancelModes"); }
  void CopySelectionToStream(TStream*) override { Record("CopySelectionToStream"); }
  bool IsView() override { return static_cast<bool>(Master); }
  bool SpecialPropertyHelp(const String& Member, String& Keyword, String&, int& HelpType) override {
    Keyword = FName + "." + Member;
    HelpType = 0;
    return true;
  }
  // IDesigner: what designers and tool windows may ask
  void Modified() override { Record("Modified"); }
  void Notification(TPersistent*, TOperation) override {}
  void ValidateRename(TComponent*, const String& CurName, const String& NewName) override {
    Record("ValidateRename(" + CurName + "," + NewName + ")");
  }
  void Activate() override { Record("Activate"); }
  TMethod CreateMethod(const String&, const TTypeData*) override { return {}; }
  TMethod CreateMethod(const String&, const IPtr<IEventInfo>&) override { return {}; }
  String GetMethodName(const TMethod&) override { return ""; }
  void GetMethods(const TTypeData*, const TGetStrProc&) override {}
  bool MethodExists(const String&) override { return false; }
  void RenameMethod(const String&, const String&) override {}
  void ShowMethod(const String&) override {}
  void ChainCall(const String&, const String&, const String&, const TTypeData*) override {}
  void SetSelections(const IPtr<IDesignerSelections>& List) override {
    Selected.clear();
    for (int I = 0; List && I < List->GetCount(); ++I) Selected.push_back(List->Get(I));
  }
  void SelectComponent(TPersistent* Instance) override { Selected = {Instance}; }
  void SelectComponent(const IPtr<IDesignObject>&) override {}
  void ClearSelection() override { Selected.clear(); }
  void NoSelection() override { Selected.clear(); }
  void DeleteSelection(bool) override {}
  String UniqueName(const String& BaseName) override { return BaseName + "1"; }
  TComponent* GetComponent(const String& Name) override { return FRoot->FindComponent(Name); }
  String GetComponentName(TComponent* Component) override { return Component ? Component->Name() : ""; }
  void GetComponentNames(const TTypeData*, const TGetStrProc&) override {}
  TPersistent* GetObject(const String& Name) override { return FRoot->FindComponent(Name); }
  String GetObjectName(TPersistent* Instance) override { return Instance ? Instance->GetNamePath() : ""; }
  void GetObjectNames(const TTypeData*, const TGetStrProc&) override {}
  String GetRootClassName() override { return FRoot->ClassName(); }
  bool IsComponentLinkable(TComponent*) override { return false; }
  void MakeComponentLinkable(TComponent*) override {}
  bool IsComponentHidden(TComponent*) override { return false; }
  void GetProjectModules(const TGetModuleProc&) override {}
  IPtr<IDesigner> GetAncestorDesigner() override { return nullptr; }
  TComponent* FindRootAncestor(const String&) override { return nullptr; }
  void ModuleFileNames(String& Impl, String& Intf, String& Form) override {
    Impl = FName + ".src";
    Intf.clear();
    Form = GetFileName();
  }
  TComponent* CreateComponent(TClass, TComponent*, int, int, int, int) override { return nullptr; }
  TComponent* CreateChild(TClass, TComponent*) override { return nullptr; }
  TComponent* CreateCurrentComponent(TComponent*, const TRect&) override { return nullptr; }
  TComponent* CreateCurrentComponentScaled(TComponent*, const TRect&, bool) override { return nullptr; }
  TComponent* GetCurrentParent() override { return FRoot; }
  IPtr<IOTABasePaletteItem> GetPaletteItem(TClass) override { return nullptr; }
  void Revert(TPersistent*, PPropInfo) override {}
  void Edit(TComponent*) override {}
  String GetPathAndBaseExeName() override { return ""; }
  String GetPrivateDirectory() override { return ""; }
  String GetBaseRegKey() override { return ""; }
  bool GetIsDormant() override { return Dormant; }
  void ModalEdit(char, const IPtr<IActivatable>&) override {}
  void SelectItemName(const String&) override {}
  String GetAppDataDirectory(bool) override { return ""; }
  String GetDesignerExtension() override { return ".kfm"; }
  IPtr<IInterface> GetIDEOptions() override { return nullptr; }
  TRect GetScrollRanges(const TPoint&) override { return {}; }
  bool MethodFromAncestor(const TMethod&) override { return false; }
  bool IsSourceReadOnly() override { return false; }
  TShiftState GetShiftState() override { return ShiftState; }
  // IOTAAlignable
  void Align(TOTAAffect) override { Record("Align"); }
  void Size(TOTASizeAffect, int) override { Record("Size"); }

private:
  String FName;
  TCallLog* FLog;
  TComponent* FRoot = nullptr;
};

} // namespace formkit::fakes
