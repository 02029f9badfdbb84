//===- core/DesignIntfDesigner.h - The designer interface chain ----------===//
//
// `IDesigner` and its frozen versions: the interface of a designed module as
// editors and tool windows see it. Each version adds at its end; the plain name
// is the newest. Included by DesignIntf.h.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

struct IOTABasePaletteItem;

/// Called for each module of the project with the host's module information.
using TGetModuleProc = std::function<void(const IPtr<IInterface>& ModuleInfo)>;

struct FK_API IDesigner60 : IDesignerNotify {
  FK_INTERFACE(IDesigner60, IDesignerNotify, "{2ADE84E1-AB8D-5452-9059-C8A4C724F797}")
  // Notification
  virtual void Activate() = 0;
  // Methods of the designed class
  virtual TMethod CreateMethod(const String& Name, const TTypeData* TypeData) = 0;
  virtual TMethod CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) = 0;
  virtual String GetMethodName(const TMethod& Method) = 0;
  virtual void GetMethods(const TTypeData* TypeData, const TGetStrProc& Proc) = 0;
  virtual bool MethodExists(const String& Name) = 0;
  virtual void RenameMethod(const String& CurName, const String& NewName) = 0;
  virtual void ShowMethod(const String& Name) = 0;
  virtual void ChainCall(const String& MethodName, const String& InstanceName,
                         const String& InstanceMethod, const TTypeData* TypeData) = 0;
  // Selection
  virtual void GetSelections(const IPtr<IDesignerSelections>& List) = 0;
  virtual void SetSelections(const IPtr<IDesignerSelections>& List) = 0;
  virtual void SelectComponent(TPersistent* Instance) = 0;
  virtual void SelectComponent(const IPtr<IDesignObject>& Instance) = 0;
  virtual void ClearSelection() = 0;
  virtual void NoSelection() = 0;
  virtual void DeleteSelection(bool ADoAll) = 0;
  // Names and lookups
  virtual String UniqueName(const String& BaseName) = 0;
  virtual TComponent* GetComponent(const String& Name) = 0;
  virtual String GetComponentName(TComponent* Component) = 0;
  virtual void GetComponentNames(const TTypeData* TypeData, const TGetStrProc& Proc) = 0;
  virtual TPersistent* GetObject(const String& Name) = 0;
  virtual String GetObjectName(TPersistent* Instance) = 0;
  virtual void GetObjectNames(const TTypeData* TypeData, const TGetStrProc& Proc) = 0;
  virtual TComponent* GetRoot() = 0;
  virtual String GetRootClassName() = 0;
  // Linking across modules
  virtual bool IsComponentLinkable(TComponent* Component) = 0;
  virtual void MakeComponentLinkable(TComponent* Component) = 0;
  virtual bool IsComponentHidden(TComponent* Component) = 0;
  virtual void GetProjectModules(const TGetModuleProc& Proc) = 0;
  virtual IPtr<IDesigner> GetAncestorDesigner() = 0;
  virtual TComponent* FindRootAncestor(const String& Name) = 0;
  virtual void ModuleFileNames(String& ImplFileName, String& IntfFileName, String& FormFileName) = 0;
  // Creating
  virtual TComponent* CreateComponent(TClass ComponentClass, TComponent* Parent, int Left, int Top,
                                      int Width, int Height) = 0;
  virtual TComponent* CreateChild(TClass ComponentClass, TComponent* Parent) = 0;
  virtual TComponent* CreateCurrentComponent(TComponent* Parent, const TRect& Rect) = 0;
  virtual TComponent* GetCurrentParent() = 0;
  virtual IPtr<IOTABasePaletteItem> GetPaletteItem(TClass ComponentClass) = 0;
  // State
  virtual void Revert(TPersistent* Instance, PPropInfo PropInfo) = 0;
  virtual void Edit(TComponent* Component) = 0;
  // Host paths and settings
  virtual String GetPathAndBaseExeName() = 0;
  virtual String GetPrivateDirectory() = 0;
  virtual String GetBaseRegKey() = 0;
};
struct FK_API IDesigner70 : IDesigner60 {
  FK_INTERFACE(IDesigner70, IDesigner60, "{6599235B-0ACF-58C5-A656-376B0D80AA56}")
  virtual bool GetIsDormant() = 0;
  virtual void Resurrect() = 0;
};
struct FK_API IDesigner80 : IDesigner70 {
  FK_INTERFACE(IDesigner80, IDesigner70, "{AB965C9A-2187-5203-A599-EA1FE63BA5E0}")
  virtual void ModalEdit(char EditKey, const IPtr<IActivatable>& ReturnWindow) = 0;
  virtual void SelectItemName(const String& PropertyName) = 0;
  virtual String GetAppDataDirectory(bool Local) = 0;
};
struct FK_API IDesigner100 : IDesigner80 {
  FK_INTERFACE(IDesigner100, IDesigner80, "{021D1089-8730-57B4-8BFF-60CE10C488A7}")
  virtual String GetDesignerExtension() = 0;
};
struct FK_API IDesigner170 : IDesigner100 {
  FK_INTERFACE(IDesigner170, IDesigner100, "{7882CC3A-580F-5DB1-9EAE-95FC1491C3AF}")
  /// The host's option store.
  virtual IPtr<IInterface> GetIDEOptions() = 0;
};
struct FK_API IDesigner200 : IDesigner170 {
  FK_INTERFACE(IDesigner200, IDesigner170, "{DD881C5F-E35F-551D-A901-BE54E2DCB9D2}")
  virtual TRect GetScrollRanges(const TPoint& ScrollPosition) = 0;
};
struct FK_API IDesigner290 : IDesigner200 {
  FK_INTERFACE(IDesigner290, IDesigner200, "{A92282B6-AC17-59F4-AE9F-F2D0AC8473B6}")
  virtual bool MethodFromAncestor(const TMethod& Method) = 0;
};
/// The interface of a designed module: the newest of the chain.
struct FK_API IDesigner : IDesigner290 {
  FK_INTERFACE(IDesigner, IDesigner290, "{90FD7103-D315-50DE-86E9-ECC178430A84}")
  virtual bool IsSourceReadOnly() = 0;
};

} // namespace formkit
