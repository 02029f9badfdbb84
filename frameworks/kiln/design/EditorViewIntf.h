//===- frameworks/kiln/design/EditorViewIntf.h - Host faces of editor sub-views ===//
//
// The operations this package calls on, or offers to, the host for a module
// designed inside a page of the code editor. The host's catalogue knows
// `INTACustomEditorSubView`, `IOTADesignerDeviceServices`, the personality and
// the platform services by identity alone; published interfaces never change,
// so their operations are side interfaces here, each with a fixed identity of
// its own, which the same objects answer to. Beside them: the structure view
// face of a sub-view, the closing flag, the wrapper query of a view object, the
// view support of a framework's host control, the operating system families,
// and the designer hook of a form that takes the keys typed into it.
//
// Example:
//   if (auto Devices = QueryAs<IDesignerDeviceOperations>(IDEService<IOTADesignerDeviceServices>())) {
//     TDesignerDeviceEntry Entry;
//     if (Devices->FindDevice("Phone", Entry)) Order = Entry.Order;
//   }
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "frameworks/kiln/KilnMessages.h"
#include "tools/EditorViewAPI.h"
#include "tools/PlatformAPI.h"
#include "tools/ToolsAPI.h"

#include <vector>

namespace formkit {

class TControl;
class TEditorFormDesignerWrapper;

/// The operating system families a preview style stands for; their names are
/// "Windows", "macOS", "iOS", "Android", "Linux" and "Unknown" (`OSFamilyName`).
FK_ENUM(TOTAOSFamily, std::uint8_t, osfWindows, osfOSX, osfiOS, osfAndroid, osfLinux, osfUndefined)

/// The display name of a family.
FK_API String OSFamilyName(TOTAOSFamily Family);

//===----------------------------------------------------------------------===//
// Sub-views of an editor tab
//===----------------------------------------------------------------------===//

/// What a sub-view of an editor tab does for the host. The host's tab shows the sub-view's
/// frame (of `GetFrameClass`) as `ViewObject` and passes the tab's `Context` (its module,
/// as `IOTAModule`, or null) to each call. The object that answers here also answers
/// `INTACustomEditorSubView`.
struct FK_API IEditorSubViewOperations : IInterface {
  FK_INTERFACE(IEditorSubViewOperations, IInterface, "{9D0EDF89-7D6E-40BD-9A6D-E1638FAEB1D3}")
  /// Whether the host may open the sub-view in a second tab of the same file.
  virtual bool GetCanCloneView() = 0;
  /// The caption of the sub-view's tab.
  virtual String GetCaption() = 0;
  /// The host's ordering of sub-views: the lower, the further left.
  virtual int GetPriority() = 0;
  /// The identifier under which the host remembers which sub-view was shown.
  virtual String GetViewIdentifier() = 0;
  /// The sub-view is shown for `Context` in its frame `ViewObject`.
  virtual void Display(const IPtr<IInterface>& Context, TObject* ViewObject) = 0;
  /// The host made the frame `ViewObject` of class `GetFrameClass`.
  virtual void FrameCreated(TObject* ViewObject) = 0;
  /// The sub-view's tab is hidden.
  virtual void Hide(const IPtr<IInterface>& Context, TObject* ViewObject) = 0;
  /// The tab showing `ViewObject` closes; the frame goes after this call.
  virtual void ViewClosed(const IPtr<IInterface>& Context, TObject* ViewObject) = 0;
  /// Carries out an editing command; false when nothing did it.
  virtual bool EditAction(const IPtr<IInterface>& Context, TEditAction Action, TObject* ViewObject) = 0;
  /// The editing commands available now.
  virtual TEditState GetEditState(const IPtr<IInterface>& Context, TObject* ViewObject) = 0;
  /// The class of frame the host makes for the sub-view; null for none.
  virtual TClass GetFrameClass() = 0;
  /// Whether the sub-view has something to show for `Context`.
  virtual bool Handles(const IPtr<IInterface>& Context) = 0;
};

/// What the structure view asks of a sub-view.
struct FK_API IOTACustomEditorSubViewStructure : IInterface {
  FK_INTERFACE(IOTACustomEditorSubViewStructure, IInterface, "{E597AA89-3E34-449A-BDFC-0B3731200150}")
  /// The kind of tree the structure view shows for the sub-view.
  virtual String GetStructureType() = 0;
  /// The object the structure view shows for the sub-view's frame; null for none.
  virtual IPtr<IInterface> GetStructureContext(const IPtr<IInterface>& Context, TObject* ViewObject) = 0;
};

/// A sub-view told that its tab closes, so that it stops announcing hidden designers.
struct FK_API IInternalNotifyClosing : IInterface {
  FK_INTERFACE(IInternalNotifyClosing, IInterface, "{755F1000-A4E3-4912-B394-51F85DE81537}")
  virtual void SetClosing(bool Value) = 0;
};

/// A view object that knows the framework wrapper it shows.
struct FK_API IGetEditorFormDesignerWrapper : IInterface {
  FK_INTERFACE(IGetEditorFormDesignerWrapper, IInterface, "{D88BD34B-6353-4E1B-B861-47705189ABAF}")
  /// The wrapper of the view object, or null. Not counted: the wrapper is the framework's.
  virtual TEditorFormDesignerWrapper* GetWrapper() = 0;
};

//===----------------------------------------------------------------------===//
// Devices, personalities and platforms
//===----------------------------------------------------------------------===//

/// A device as the host's designer device service knows it.
struct TDesignerDeviceEntry {
  /// The name shown for the device.
  String Name;
  /// The place of the device in the host's ordering (lower first).
  int Order = 0;
};

/// The operations of the host's designer device service; answered by the object that
/// answers `IOTADesignerDeviceServices`.
struct FK_API IDesignerDeviceOperations : IInterface {
  FK_INTERFACE(IDesignerDeviceOperations, IInterface, "{F9505842-6439-4644-A7E8-6F08FD37DB91}")
  /// Fills `Entry` for the device `ID` (any case) and answers true when the service
  /// offers that device for the current personality; false leaves `Entry` as it was.
  virtual bool FindDevice(const String& ID, TDesignerDeviceEntry& Entry) = 0;
};

/// The operations of the host's personality services; answered by the object that
/// answers `IOTAPersonalityServices`.
struct FK_API IPersonalityOperations : IInterface {
  FK_INTERFACE(IPersonalityOperations, IInterface, "{F816C455-21B4-49B9-A67D-A970F77166C7}")
  /// The identifier of the personality in use.
  virtual String GetCurrentPersonality() = 0;
  /// The platforms `Personality` builds for; empty when it names none.
  virtual std::vector<String> GetPersonalityPlatforms(const String& Personality) = 0;
};

/// The operations of the host's platform services; answered by the object that answers
/// `IOTAPlatformServices`.
struct FK_API IPlatformOperations : IInterface {
  FK_INTERFACE(IPlatformOperations, IInterface, "{0560DA10-A9E1-45C6-BA9A-5089414752F6}")
  /// Every platform the host knows.
  virtual std::vector<String> GetAllPlatforms() = 0;
  /// The operating system family of `Platform`; `osfUndefined` for an unknown one.
  virtual TOTAOSFamily GetPlatformOSFamily(const String& Platform) = 0;
};

//===----------------------------------------------------------------------===//
// The framework's side
//===----------------------------------------------------------------------===//

/// A framework's host control of a designed form: how the form is previewed. A
/// framework answers it from a control among the parents of the active view's root.
struct FK_API IViewDesignSupport : IInterface {
  FK_INTERFACE(IViewDesignSupport, IInterface, "{10F24488-757E-42CC-A495-4FB267A3D45D}")
  /// Turns the previewed device a quarter round (portrait and landscape).
  virtual void RotateView() = 0;
  /// Shows or hides the device's frame around the form.
  virtual void ToggleBackground() = 0;
  /// Previews the master in the style of `Family`.
  virtual void SelectStyle(TOTAOSFamily Family) = 0;
  /// Whether the preview stands in landscape.
  virtual bool GetLandscape() = 0;
  /// Whether the device's frame is shown.
  virtual bool GetBackgroundVisible() = 0;
  /// The style previewed now.
  virtual TOTAOSFamily GetStyle() = 0;
  /// The device previewed; empty for the master.
  virtual String GetDevice() = 0;
  /// Previews the device `ID`; empty for the master's own size.
  virtual void SetDevice(const String& ID) = 0;
  /// The zoom of the preview in percent.
  virtual int GetZoom() = 0;
  virtual void SetZoom(int Percent) = 0;
  /// Draws the preview again.
  virtual void RefreshView() = 0;
};

/// What a designer offers a form it designs so that the keys typed into the form reach
/// the designer first.
struct FK_API IDesignerHook : IInterface {
  FK_INTERFACE(IDesignerHook, IInterface, "{DA8A1AC0-DFC7-4152-881B-33813B149545}")
  /// True when the designer took `Message`, sent to `Sender`; the control then does not
  /// see it.
  virtual bool IsDesignMsg(TControl* Sender, TMessage& Message) = 0;
};

} // namespace formkit
