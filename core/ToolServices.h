//===- core/ToolServices.h - The tool interfaces the design core calls ---===//
//
// The few interfaces of the host's tool catalogue that the design core itself
// calls or implements: the palette, palette items, modules and their notifiers,
// form editors and the components they hand out, alignment, and the
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

class TComponent;
class TPersistent;
class TStream;
struct IStream;
struct IDesigner;
struct IOTAComponent;
struct IOTAEditor;

/// The address of an object of a designed module, as the tool interfaces pass it.
using TOTAHandle = void*;

/// Called by `IOTAComponent::GetChildren` for each child with the caller's `Param`;
/// clearing `Result` stops the walk.
using TOTAGetChildCallback = void (*)(void* Param, const IPtr<IOTAComponent>& Child,
                                      bool& Result);

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

/// Watches a module.
struct FK_API IOTAModuleNotifier : IOTANotifier {
  FK_INTERFACE(IOTAModuleNotifier, IOTANotifier, "{8E668E3F-0FC5-5469-9F36-67E21B3957AE}")
  /// True when the module may overwrite its file.
  virtual bool CheckOverwrite() = 0;
  /// The module's file name became `NewName`.
  virtual void ModuleRenamed(const String& NewName) = 0;
};

/// The host's record of an open module.
struct FK_API IOTAModule40 : IInterface {
  FK_INTERFACE(IOTAModule40, IInterface, "{8FE4F438-7526-5C98-95FF-51F8899EDDB6}")
  virtual String GetFileName() = 0;
  virtual int GetModuleFileCount() = 0;
  /// The name of the module's file at `Index` (source, interface, form).
  virtual String GetModuleFileName(int Index) = 0;
  /// Registers a notifier; the result is its handle for `RemoveNotifier`.
  virtual int AddNotifier(const IPtr<IOTAModuleNotifier>& Notifier) = 0;
  /// Drops the notifier with that handle; other handles stay valid.
  virtual void RemoveNotifier(int Index) = 0;
  /// The editor of the module's file at `Index`, or null.
  virtual IPtr<IOTAEditor> GetModuleFileEditor(int Index) = 0;
  /// Saves the module, under a new name when `ChangeName`; `ForceSave` saves it unchanged.
  virtual bool Save(bool ChangeName, bool ForceSave) = 0;
  /// Closes the module; `ForceClosed` closes it without asking to save. True when closed.
  virtual bool CloseModule(bool ForceClosed) = 0;
  /// Renames the module's file.
  virtual void SetFileName(const String& Name) = 0;
  /// Moves the module to the file system registered as `FileSystem`; empty for the disk.
  virtual void SetFileSystem(const String& FileSystem) = 0;
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

/// Watches a form editor.
struct FK_API IOTAFormNotifier : IOTANotifier {
  FK_INTERFACE(IOTAFormNotifier, IOTANotifier, "{B4F71BCC-E0EE-59FA-A453-FF39BA1ACC73}")
  /// The form became the active one.
  virtual void FormActivated() = 0;
  /// The form is about to be written.
  virtual void FormSaving() = 0;
  /// A component of the form, or the form itself, was renamed.
  virtual void ComponentRenamed(TOTAHandle ComponentHandle, const String& OldName,
                                const String& NewName) = 0;
};

/// The framework object behind an `IOTAComponent`.
struct FK_API INTAComponent : IInterface {
  FK_INTERFACE(INTAComponent, IInterface, "{46FD538B-F8FE-58B2-A4BD-C35EBFF168D1}")
  virtual TPersistent* GetPersistent() = 0;
  /// The object when it is a component, else null.
  virtual TComponent* GetComponent() = 0;
};

/// A short string in a property buffer: a length byte and at most 255 bytes of text.
struct TOTAShortString {
  std::uint8_t Length = 0;
  char Chars[255] = {};
};

/// One object of a designed module. A wrapper does not keep its object alive: one held
/// after its object is freed stands for a stale address.
///
/// The property buffers of `GetPropValue` and `SetProp` are objects of the caller, of a
/// type given by the property's kind: `std::int32_t` for `tkInteger`, `tkChar`,
/// `tkEnumeration`, `tkSet` and `tkWChar` on a get (a set reads the width of the type's
/// ordinal type: `std::int8_t`, `std::uint8_t`, `std::int16_t`, `std::uint16_t`, or 32
/// bits); `long double` for `tkFloat`; `TOTAShortString` for `tkString`;
/// `IPtr<IOTAComponent>` for `tkClass` (get only: a wrapper for an object that is no
/// component, else null); `TMethod` for `tkMethod`; `String` for `tkLString` and
/// `tkUString`; `WideString` for `tkWString`; `TVariant` for `tkVariant`. Other kinds
/// give false.
struct FK_API IOTAComponent : IInterface {
  FK_INTERFACE(IOTAComponent, IInterface, "{D985325D-F3E4-5F22-B03C-B24891B63A3A}")
  /// The class name of the object.
  virtual String GetComponentType() = 0;
  /// The object's address, for `GetComponentFromHandle` of the form editor.
  virtual TOTAHandle GetComponentHandle() = 0;
  /// The visual parent, or null.
  virtual IPtr<IOTAComponent> GetParent() = 0;
  /// True when the object is a control of its framework.
  virtual bool IsTControl() = 0;
  /// The number of published properties.
  virtual int GetPropCount() = 0;
  /// The name of property `Index`; empty outside the range.
  virtual String GetPropName(int Index) = 0;
  /// The kind of property `Index`; `tkUnknown` outside the range.
  virtual TTypeKind GetPropType(int Index) = 0;
  /// The kind of the property named `Name`; `tkUnknown` for an unknown name.
  virtual TTypeKind GetPropTypeByName(const String& Name) = 0;
  /// Stores the value of property `Index` in the caller's buffer, laid out by its kind.
  virtual bool GetPropValue(int Index, void* Value) = 0;
  virtual bool GetPropValueByName(const String& Name, void* Value) = 0;
  /// Sets property `Index` from the caller's buffer, laid out by its kind.
  virtual bool SetProp(int Index, const void* Value) = 0;
  virtual bool SetPropByName(const String& Name, const void* Value) = 0;
  /// Calls `Proc` with `Param` for each child in stream order; false when not possible.
  virtual bool GetChildren(void* Param, TOTAGetChildCallback Proc) = 0;
  /// The number of controls parented by the object.
  virtual int GetControlCount() = 0;
  virtual IPtr<IOTAComponent> GetControl(int Index) = 0;
  /// The number of components the object owns; -1 when it is no component.
  virtual int GetComponentCount() = 0;
  virtual IPtr<IOTAComponent> GetComponent(int Index) = 0;
  /// Selects the object on its surface.
  virtual bool Select(bool AddToSelection) = 0;
  /// Selects the object and brings it into view for editing.
  virtual bool Focus(bool AddToSelection) = 0;
  /// Deletes the object from its module.
  virtual bool Delete() = 0;
};

/// A module's form as add-ins see it.
struct FK_API IOTAFormEditor : IOTAEditor {
  FK_INTERFACE(IOTAFormEditor, IOTAEditor, "{30B4A3C4-4BF3-590D-823D-662F73E7B3AA}")
  /// The root component of the form.
  virtual IPtr<IOTAComponent> GetRootComponent() = 0;
  /// The component of the form named `Name`, or null.
  virtual IPtr<IOTAComponent> FindComponent(const String& Name) = 0;
  /// The object at `ComponentHandle`, unchecked; null for a null handle.
  virtual IPtr<IOTAComponent> GetComponentFromHandle(TOTAHandle ComponentHandle) = 0;
  /// The number of selected objects.
  virtual int GetSelCount() = 0;
  /// Selected object `Index`; with nothing selected, index 0 is the root component.
  virtual IPtr<IOTAComponent> GetSelComponent(int Index) = 0;
  /// The component that a new control would be put on, or null.
  virtual IPtr<IOTAComponent> GetCreateParent() = 0;
  /// A new component of class `TypeName` in `Container` (or the form) at the bounds given;
  /// null when the class is unknown or no component.
  virtual IPtr<IOTAComponent> CreateComponent(const IPtr<IOTAComponent>& Container, const String& TypeName,
                                              int X, int Y, int W, int H) = 0;
  /// Writes the form's stream into the host's `Stream` and rewinds it.
  virtual void GetFormResource(const IPtr<IStream>& Stream) = 0;
};

/// The framework side of a form editor.
struct FK_API INTAFormEditor : IInterface {
  FK_INTERFACE(INTAFormEditor, IInterface, "{6E2DE679-AFD7-5783-B8CB-556531986F14}")
  /// The designer of the form.
  virtual IPtr<IDesigner> GetFormDesigner() = 0;
  /// Writes the form's stream into `Stream` and rewinds it.
  virtual void GetFormResource(TStream* Stream) = 0;
};

/// The whole content of an editor as one stream.
struct FK_API IOTAEditorContent : IInterface {
  FK_INTERFACE(IOTAEditorContent, IInterface, "{39A31AB6-4E03-5D82-9692-627E272722F6}")
  /// A stream over the current content.
  virtual IPtr<IStream> GetContent() = 0;
  /// Replaces the content by that of `Content`.
  virtual void SetContent(const IPtr<IStream>& Content) = 0;
  /// The time of the content's last change.
  virtual TDateTime GetContentAge() = 0;
  /// Takes the current content as the one on disk.
  virtual void ResetDiskAge() = 0;
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
