//===- core/Designers.h - The one collection of designers ----------------===//
//
// `Designers`: every framework designer registers here; one of them is active,
// and the host talks to all of them through this one entry point. Designer
// packages register an initializer with `RegisterInitializeDesigner`; the host
// calls `InitializeDesigners` once it has its environment.
//
// Example:
//   RegisterInitializeDesigner(&InitializeMyDesigner);   // while the package loads
//   InitializeDesigners(Environment);                      // the host, at start
//   IPtr<IComponentDesigner> D = Designers()->DesignerFromExtension(".kfm");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "core/Events.h"

namespace formkit {

/// The collection of designers; one instance while the core runs.
class FK_API TDesigners : public TInterfacedObject, public IInternalComponentDesigners {
  FK_CLASS(TDesigners, TInterfacedObject)
  FK_INTERFACES(IInternalComponentDesigners)

  // IComponentDesigners
  bool DesignerActive() override;
  void DesignerOptionsChanged() override;
  bool FindFile(const String& Name, IPtr<IRoot>& Root) override;
  IPtr<IComponentDesigner> GetActiveDesigner() override { return FActiveDesigner; }
  void HideWindows() override;
  void ShowWindows() override;
  void SetProjectName(const String&) override {}
  void SetControlsLocked(bool Value) override;
  bool GetControlsLocked() override;
  IPtr<IOTAAlignable> GetAlignable() override;
  void GetSelection(const IPtr<IDesignerSelections>& List) override;
  void SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                    const IPtr<IDesignerSelections>& Selections) override;
  void ShowComponentHelp() override;
  bool SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) override;
  void GetProperties(const TGetPropProc& Proc) override;
  String GetFirstSelectionType() override;
  String GetFirstSelectionUnit() override;
  std::vector<String> RegisteredExtensions() override { return FExtensions; }
  std::vector<TClass> InvalidDataModuleClasses() override { return FDataModuleClasses; }
  IPtr<IComponentDesigner> DesignerFromExtension(const String& Ext) override;
  bool RootComponentClass(TClass ComponentClass) override;
  String GetCustomModuleIdentifier(const IPtr<ICustomModule>& CustomModule) override;
  void DesignerDeactivated() override;
  void ForEachDesigner(const TDesignerIterFunc& Func) override;

  // IInternalComponentDesigners
  void RegisterDesigner(const IPtr<IComponentDesigner>& Designer) override;
  void UnregisterDesigner(const IPtr<IComponentDesigner>& Designer) override;
  void ActivateDesigner(const IPtr<IComponentDesigner>& Designer) override;
  void RootRemoved(const IPtr<IRoot>& Root) override;

  /// Tells the root-activated handlers that a surface outside this library took over;
  /// they get a null sender and the stub custom module. The palette is not touched.
  void ActivateNonKilnDesigner();

private:
  IPtr<IInternalRoot> ActiveInternalRoot();
  IPtr<IComponentDesigner> FActiveDesigner;
  IPtr<IRoot> FActiveRoot;
  std::vector<IPtr<IComponentDesigner>> FDesigners;
  std::vector<String> FExtensions;
  std::vector<TClass> FDataModuleClasses;
};

/// The collection; null before the core starts and after it stops.
FK_API IPtr<IInternalComponentDesigners> Designers();
/// The active designer, or null.
FK_API IPtr<IComponentDesigner> ActiveDesigner();
/// The active designer's active root, or null.
FK_API IPtr<IRoot> ActiveRoot();

/// Creates a framework's designer and registers it with `Designers`.
using TInitializeDesigner = void (*)(const IPtr<IDesignEnvironment>& Environment);
/// Appends `Proc`; a repeat is ignored.
FK_API void RegisterInitializeDesigner(TInitializeDesigner Proc);
/// Calls each registered procedure in order of registration, then registers the strings
/// file system through `RegisterStringsFileSystemProc`.
FK_API void InitializeDesigners(const IPtr<IDesignEnvironment>& Environment);
/// Registers (true) or unregisters (false) the strings file system; set by the tool services.
FK_API extern std::function<void(bool Register)> RegisterStringsFileSystemProc;
/// Returns the reference it was given.
FK_API IPtr<IDesignEnvironment> ProtectEnvironment(const IPtr<IDesignEnvironment>& Environment);

/// The designers unit's start and stop (the core's start and stop call them).
FK_API void InitializeDesignersUnit();
FK_API void FinalizeDesignersUnit() noexcept;

} // namespace formkit
