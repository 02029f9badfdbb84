//===- core/ToolServices.h - The tool interfaces the design core calls ---===//
//
// The few interfaces of the host's tool catalogue that the design core itself
// calls: the palette, palette items, modules, form editors, alignment, and the
// global service object through which the host offers them. The full catalogue
// (tools/ToolsAPI.h) includes this header and does not declare them again.
//
// Example:
//   if (auto Palette = QueryAs<IOTAPaletteServices>(HalvernIDEServices))
//     Palette->AddContextName("NativeDesignerActive");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/TypInfo.h"

namespace formkit {

/// How `IOTAAlignable::Align` lines up the selection.
FK_ENUM(TOTAAffect, std::uint8_t, afNothing, afTop, afLeft, afBottom, afRight, afHCenter, afVCenter,
        afHSpace, afVSpace, afHWinCenter, afVWinCenter, afHSpaceInc, afHSpaceDec, afHSpaceDel,
        afVSpaceInc, afVSpaceDec, afVSpaceDel, afAlignToGrid, afSnapToGrid, afSendToBack,
        afBringToFront)
/// How `IOTAAlignable::Size` sizes the selection.
FK_ENUM(TOTASizeAffect, std::uint8_t, asNothing, asHGrow, asHShrink, asHAbsolute, asVGrow, asVShrink,
        asVAbsolute, asWidths, asHeights, asWidthHeight, asSizeToGrid)

//===----------------------------------------------------------------------===//
// Palette
//===----------------------------------------------------------------------===//

/// One entry of the host's component palette.
struct FK_API IOTABasePaletteItem270 : IInterface {
  FK_INTERFACE(IOTABasePaletteItem270, IInterface, "{466B9683-253B-50D0-AB93-AD793882FFE7}")
  /// The entry's identifying text.
  virtual String GetIDString() = 0;
  /// Whether the entry can be used now; what it checks is the host's affair.
  virtual bool GetEnabled() = 0;
};
struct FK_API IOTABasePaletteItem280 : IOTABasePaletteItem270 {
  FK_INTERFACE(IOTABasePaletteItem280, IOTABasePaletteItem270, "{3B90C9F1-DD48-53E3-BADA-B7A8B2F8E8C6}")
};
struct FK_API IOTABasePaletteItem : IOTABasePaletteItem280 {
  FK_INTERFACE(IOTABasePaletteItem, IOTABasePaletteItem280, "{A9B83E93-2071-556C-BF7E-DE12FA05293A}")
};

/// The host's palette: context names filter what it shows; changes come in batches.
struct FK_API IOTAPaletteServices270 : IInterface {
  FK_INTERFACE(IOTAPaletteServices270, IInterface, "{6F059F0B-94A8-5EE5-A62F-8AFAC66B981A}")
  virtual void BeginUpdate() = 0;
  virtual void EndUpdate() = 0;
  virtual void AddContextName(const String& Name) = 0;
  virtual void RemoveContextName(const String& Name) = 0;
};
struct FK_API IOTAPaletteServices280 : IOTAPaletteServices270 {
  FK_INTERFACE(IOTAPaletteServices280, IOTAPaletteServices270, "{2DE9C71A-6A68-5DEF-A29D-B525533D0D06}")
};
struct FK_API IOTAPaletteServices : IOTAPaletteServices280 {
  FK_INTERFACE(IOTAPaletteServices, IOTAPaletteServices280, "{474685EC-A569-5BF2-844A-C31F506CAC04}")
};

//===----------------------------------------------------------------------===//
// Modules and forms
//===----------------------------------------------------------------------===//

/// The host's record of an open module.
struct FK_API IOTAModule40 : IInterface {
  FK_INTERFACE(IOTAModule40, IInterface, "{8FE4F438-7526-5C98-95FF-51F8899EDDB6}")
  virtual String GetFileName() = 0;
  virtual int GetModuleFileCount() = 0;
  /// The name of the module's file at `Index` (source, interface, form).
  virtual String GetModuleFileName(int Index) = 0;
};
struct FK_API IOTAModule50 : IOTAModule40 {
  FK_INTERFACE(IOTAModule50, IOTAModule40, "{E35F3FF0-C635-5005-B901-6676CB9F98E8}")
};
struct FK_API IOTAModule70 : IOTAModule50 {
  FK_INTERFACE(IOTAModule70, IOTAModule50, "{71899821-AE54-5FF6-899C-C675EA404462}")
};
struct FK_API IOTAModule140 : IOTAModule70 {
  FK_INTERFACE(IOTAModule140, IOTAModule70, "{53C11BBE-2E45-500E-B510-30785ABC6B6E}")
};
struct FK_API IOTAModule : IOTAModule140 {
  FK_INTERFACE(IOTAModule, IOTAModule140, "{49BF4898-795E-5590-BB3A-FAED23F661A4}")
};

/// The base of every notifier: told of saves, changes and the subject's end.
struct FK_API IOTANotifier : IInterface {
  FK_INTERFACE(IOTANotifier, IInterface, "{1FB81D4B-A001-533D-B108-0C7DE21BDD6A}")
  /// The subject was saved.
  virtual void AfterSave() = 0;
  /// The subject is about to be saved.
  virtual void BeforeSave() = 0;
  /// The subject goes away; release every reference to it.
  virtual void Destroyed() = 0;
  /// The subject changed.
  virtual void Modified() = 0;
};

/// One editor of a module: a source file or a form.
struct FK_API IOTAEditor : IInterface {
  FK_INTERFACE(IOTAEditor, IInterface, "{B6665FD2-3B13-5B4D-AB86-829AF667DAE8}")
  /// Registers a notifier; the result is its handle for `RemoveNotifier`.
  virtual int AddNotifier(const IPtr<IOTANotifier>& Notifier) = 0;
  virtual String GetFileName() = 0;
  /// True when the editor holds changes not yet saved.
  virtual bool GetModified() = 0;
  /// The module the editor belongs to.
  virtual IPtr<IOTAModule> GetModule() = 0;
  /// Marks the content as changed; true when that was possible.
  virtual bool MarkModified() = 0;
  /// Drops the notifier with that handle; other handles stay valid.
  virtual void RemoveNotifier(int Index) = 0;
  /// Brings the editor to the front.
  virtual void Show() = 0;
};

/// A module's form as add-ins see it.
struct FK_API IOTAFormEditor : IOTAEditor {
  FK_INTERFACE(IOTAFormEditor, IOTAEditor, "{30B4A3C4-4BF3-590D-823D-662F73E7B3AA}")
};

/// Lining up and sizing the selection of the active module.
struct FK_API IOTAAlignable : IInterface {
  FK_INTERFACE(IOTAAlignable, IInterface, "{CADF76B9-16C3-5279-B0F3-108E3C22DEEE}")
  virtual void Align(TOTAAffect Affect) = 0;
  virtual void Size(TOTASizeAffect Affect, int Value) = 0;
};

//===----------------------------------------------------------------------===//
// The global service object
//===----------------------------------------------------------------------===//

struct FK_API IHalvernIDEServices70 : IInterface {
  FK_INTERFACE(IHalvernIDEServices70, IInterface, "{A76EC2A3-23EA-5071-B34E-7A811B2E7DF7}")
};
/// The host's services; each one is reached by a cast of this object.
struct FK_API IHalvernIDEServices : IHalvernIDEServices70 {
  FK_INTERFACE(IHalvernIDEServices, IHalvernIDEServices70, "{1122D61E-2B35-5649-A573-42BDC54FCCD9}")
};

/// Assigned by the host. Null, or a failed cast, means the host does not offer a service.
FK_API extern IPtr<IHalvernIDEServices> HalvernIDEServices;

/// The service `I` of the host, or null.
template <class I> IPtr<I> IDEService() { return QueryAs<I>(HalvernIDEServices); }

} // namespace formkit
