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

/// The collection of designers; one instance while the core runs, made by the core's
/// start and reached through `Designers()`. It holds the designers by counted references,
/// in registration order, with the file extension and the plain module class of each.
/// Every walk over the designers works on a copy of the list, so a designer may
/// register or unregister others meanwhile.
class FK_API TDesigners : public TInterfacedObject, public IInternalComponentDesigners {
  FK_CLASS(TDesigners, TInterfacedObject)
  FK_INTERFACES(IInternalComponentDesigners)

  // IComponentDesigners
  /// True as soon as one designer, asked in order, says it is active.
  bool DesignerActive() override;
  /// Passes the change on to every designer, which has each module apply the options.
  void DesignerOptionsChanged() override;
  /// Asks the designers in order; the first that sets `Root` wins. False and null when
  /// none has the file.
  bool FindFile(const String& Name, IPtr<IRoot>& Root) override;
  /// The active designer, or null.
  IPtr<IComponentDesigner> GetActiveDesigner() override { return FActiveDesigner; }
  /// Passes on to every designer: the listening design windows, then the modules.
  void HideWindows() override;
  /// Passes on to every designer, as `HideWindows` does.
  void ShowWindows() override;
  /// Does nothing: no designer depends on the project's name.
  void SetProjectName(const String&) override {}
  /// Passes on to every designer, which keeps the value and tells each module.
  void SetControlsLocked(bool Value) override;
  /// The active designer's answer; false without one.
  bool GetControlsLocked() override;
  /// The active designer's active module as `IOTAAlignable`; null when there is none or
  /// it does not answer to it.
  IPtr<IOTAAlignable> GetAlignable() override;
  /// Adds the active designer's selection to `List`; nothing without one.
  void GetSelection(const IPtr<IDesignerSelections>& List) override;
  /// Hands the selection to the active designer; nothing without one.
  void SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                    const IPtr<IDesignerSelections>& Selections) override;
  /// `ShowHelp` of the active designer's active module; nothing without one.
  void ShowComponentHelp() override;
  /// Clears `HelpKeyword` and `HelpFile`, then asks the active module; false without one.
  bool SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) override;
  /// The active designer's property editors of its selection; nothing without one.
  void GetProperties(const TGetPropProc& Proc) override;
  /// From the active designer; empty without one.
  String GetFirstSelectionType() override;
  /// From the active designer; empty without one.
  String GetFirstSelectionUnit() override;
  /// A copy of the extensions, in registration order.
  std::vector<String> RegisteredExtensions() override { return FExtensions; }
  /// A copy of the plain module classes, in registration order.
  std::vector<TClass> InvalidDataModuleClasses() override { return FDataModuleClasses; }
  /// The first designer whose extension equals `Ext` without regard to case, or null.
  IPtr<IComponentDesigner> DesignerFromExtension(const String& Ext) override;
  /// Walks the custom-module registrations from the newest for one whose base class is
  /// exactly `ComponentClass`.
  bool RootComponentClass(TClass ComponentClass) override;
  /// Looks through every designer's modules in order for the one whose custom module is
  /// `CustomModule`. Cost: all open modules.
  String GetCustomModuleIdentifier(const IPtr<ICustomModule>& CustomModule) override;
  /// No designer is active any more: sends `EvDesignerDeactivated` when one was, and
  /// drops the palette's "NativeDesignerActive" context.
  void DesignerDeactivated() override;
  /// Calls `Func` over a copy of the designers until it returns false.
  void ForEachDesigner(const TDesignerIterFunc& Func) override;

  // IInternalComponentDesigners
  /// Appends `Designer` with its extension and plain module class, asked once now; it
  /// becomes active when no designer is.
  void RegisterDesigner(const IPtr<IComponentDesigner>& Designer) override;
  /// Removes `Designer` and its entries; clears the active designer and module when it
  /// was active. Nothing when it is not registered.
  void UnregisterDesigner(const IPtr<IComponentDesigner>& Designer) override;
  /// Makes `Designer` active with its active module. The same designer with the same
  /// module only refreshes the palette's context; otherwise `EvRootActivatedEvent` goes
  /// out with the module's custom module. A changed designer also calls its environment's
  /// `SelectionChanged`.
  void ActivateDesigner(const IPtr<IComponentDesigner>& Designer) override;
  /// Forgets `Root` as the active module when it is.
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
