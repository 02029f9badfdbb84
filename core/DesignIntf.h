//===- core/DesignIntf.h - The design contract ---------------------------===//
//
// The public surface of the design core for everyone who extends it: the
// enumerations, the versioned interfaces (properties, design objects,
// selections, notifications, editors, custom modules, the designer), the
// registration calls that forward through hook variables, and the small
// concrete classes `TEventInfo`, `TDesignObject`, `TClassWrapper` and
// `TDesignerSelections`.
//
// Example:
//   class TMyWindow : public TInterfacedObject, public IDesignNotification { ... };
//   RegisterDesignNotification(MyWindow);     // lost silently before the core starts
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignMenus.h"
#include "core/ToolServices.h"
#include "platform/Lists.h"

namespace formkit {

struct IProperty;
struct IDesigner;
struct IDesignObject;
struct IDesignerSelections;
struct IPropertyHost;

//===----------------------------------------------------------------------===//
// Enumerations and sets
//===----------------------------------------------------------------------===//

FK_ENUM(TPropKind, std::uint8_t, pkProperties, pkEvents)
FK_ENUM(TPropertyAttribute, std::uint8_t, paValueList, paSubProperties, paDialog, paMultiSelect,
        paAutoUpdate, paSortList, paReadOnly, paRevertable, paFullWidthName, paVolatileSubProperties,
        paKiln, paNotNestable, paDisplayReadOnly, paCustomDropDown, paValueEditable)
FK_SET(TPropertyAttributes, TPropertyAttribute)
FK_ENUM(TCustomModuleAttribute, std::uint8_t, cmaVirtualSize, cmaMultiView)
FK_SET(TCustomModuleAttributes, TCustomModuleAttribute)
FK_ENUM(TEditAction, std::uint8_t, eaUndo, eaRedo, eaCut, eaCopy, eaPaste, eaDelete, eaSelectAll,
        eaPrint, eaElide)
/// The edit states; note that `TEditStates` is the enumeration and `TEditState` the set.
FK_ENUM(TEditStates, std::uint8_t, esCanUndo, esCanRedo, esCanCut, esCanCopy, esCanPaste,
        esCanDelete, esCanEditOle, esCanPrint, esCanSelectAll, esCanCreateTemplate, esCanElide)
FK_SET(TEditState, TEditStates)
FK_ENUM(TDemandLoadState, std::uint8_t, dlDefault, dlDisable, dlEnable)
FK_ENUM(TDesignerGuideType, std::uint8_t, gtAlignLeft, gtAlignTop, gtAlignRight, gtAlignBottom,
        gtMarginLeft, gtMarginTop, gtMarginRight, gtMarginBottom, gtPaddingLeft, gtPaddingTop,
        gtPaddingRight, gtPaddingBottom, gtBaseline)

//===----------------------------------------------------------------------===//
// Callback and class-reference types
//===----------------------------------------------------------------------===//

using TGetStrProc = std::function<void(const String& S)>;
using TGetWideStrProc = std::function<void(const WideString& S)>;
using TGetPropProc = std::function<void(const IPtr<IProperty>& Prop)>;
using TGetDesignerEvent = std::function<void(TObject* Sender, IPtr<IDesigner>& ADesigner)>;
using TPropertyEditorFilterFunc = std::function<bool(const IPtr<IProperty>& ATestEditor)>;
/// Class references to the editor and module bases below; each has a virtual constructor.
using TPropertyEditorClass = TClass;
using TComponentEditorClass = TClass;
using TSelectionEditorClass = TClass;
using TCustomModuleClass = TClass;
using TDragTargetClass = TClass;
using TComponentGuidelinesClass = TClass;

/// Read by property editors; both start true.
FK_API extern bool GReferenceExpandable;
FK_API extern bool GShowReadOnlyProps;

//===----------------------------------------------------------------------===//
// Properties
//===----------------------------------------------------------------------===//

/// A parsed copy of the signature of a method-pointer type.
struct FK_API IEventInfo : IInterface {
  FK_INTERFACE(IEventInfo, IInterface, "{80F64630-CE8C-5C48-8071-A2D7D7148E89}")
  virtual TMethodKind GetMethodKind() = 0;
  virtual int GetParamCount() = 0;
  virtual String GetParamName(int Index) = 0;
  virtual String GetParamType(int Index) = 0;
  virtual TParamFlags GetParamFlags(int Index) = 0;
  virtual String GetResultType() = 0;
};

/// What the inspector sees of one property of the selection; values pass as text.
struct FK_API IProperty : IInterface {
  FK_INTERFACE(IProperty, IInterface, "{52203F0E-3D62-5988-AAEF-ADC344DC867B}")
  virtual void Activate() = 0;
  virtual bool AllEqual() = 0;
  virtual bool AutoFill() = 0;
  virtual void Edit() = 0;
  virtual bool HasInstance(TPersistent* Instance) = 0;
  virtual TPropertyAttributes GetAttributes() = 0;
  virtual int GetEditLimit() = 0;
  virtual bool GetEditValue(String& Value) = 0;
  virtual String GetName() = 0;
  virtual void GetProperties(const TGetPropProc& Proc) = 0;
  virtual PPropInfo GetPropInfo() = 0;
  virtual PTypeInfo GetPropType() = 0;
  virtual String GetValue() = 0;
  virtual void GetValues(const TGetStrProc& Proc) = 0;
  virtual void Revert() = 0;
  virtual void SetValue(const String& Value) = 0;
  virtual bool ValueAvailable() = 0;
};
struct FK_API IProperty70 : IProperty {
  FK_INTERFACE(IProperty70, IProperty, "{0D488999-0288-5E19-9724-5B95FD45A493}")
  virtual bool GetIsDefault() = 0;
};
struct FK_API IProperty80 : IProperty {
  FK_INTERFACE(IProperty80, IProperty, "{EB8A26EA-4BE9-5C0F-B2DC-DB6967CD0FE0}")
  using IProperty::Edit;
  virtual void Edit(const IPtr<IPropertyHost>& Host, bool DblClick) = 0;
};
struct FK_API IProperty160 : IProperty {
  FK_INTERFACE(IProperty160, IProperty, "{5B6F3BA3-F267-58D3-B955-5DB065865575}")
};
struct FK_API IPropertyKind : IInterface {
  FK_INTERFACE(IPropertyKind, IInterface, "{552DB6E9-FF7C-5CE8-B4CC-BF756965D02B}")
  virtual TTypeKind GetKind() = 0;
};
struct FK_API IPropertyControl : IInterface {
  FK_INTERFACE(IPropertyControl, IInterface, "{0EC267AC-F783-569B-93DC-FEC7D4537410}")
};
/// Wide forms of the value operations.
struct FK_API IWideProperty : IInterface {
  FK_INTERFACE(IWideProperty, IInterface, "{CD779ACF-3CA4-5D2B-B151-E6CBA99D9A11}")
  virtual WideString GetValueW() = 0;
  virtual bool GetEditValueW(WideString& Value) = 0;
  virtual void SetValueW(const WideString& Value) = 0;
};
struct FK_API IWideProperty10 : IInterface {
  FK_INTERFACE(IWideProperty10, IInterface, "{4A003DB3-DC16-5F67-B43A-9ECB36A348E4}")
  virtual WideString GetNameW() = 0;
  virtual void GetValuesW(const TGetWideStrProc& Proc) = 0;
};
/// Marks event editors.
struct FK_API IMethodProperty : IInterface {
  FK_INTERFACE(IMethodProperty, IInterface, "{A488DB77-640F-5285-989F-F606B7B15029}")
};
struct FK_API IReferenceProperty : IInterface {
  FK_INTERFACE(IReferenceProperty, IInterface, "{315DCFA6-DC10-5135-8E61-51AD4209D555}")
  virtual TComponent* GetComponentReference() = 0;
};
struct FK_API IShowReferenceProperty : IInterface {
  FK_INTERFACE(IShowReferenceProperty, IInterface, "{0CEF6361-4B21-5048-B127-3FCA6D71145F}")
  virtual bool ShowReferenceProperty() = 0;
};
struct FK_API IPropertyDescription : IInterface {
  FK_INTERFACE(IPropertyDescription, IInterface, "{98A59879-978A-56F1-8BC5-1814F110C6B0}")
};
struct FK_API IWidePropertyDescription : IInterface {
  FK_INTERFACE(IWidePropertyDescription, IInterface, "{6AD41902-A449-5735-91AF-EF6E87A942A0}")
};
/// The inspector's side of an edit with a drop-down.
struct FK_API IPropertyHost : IInterface {
  FK_INTERFACE(IPropertyHost, IInterface, "{73243FCA-54BD-5C0C-87A4-CB1179AEF307}")
  virtual void DropDownControl(TComponent* Control) = 0;
  virtual void CloseDropDown() = 0;
};
struct FK_API IPropertyHost20 : IInterface {
  FK_INTERFACE(IPropertyHost20, IInterface, "{289CCBC6-1815-51BA-A560-16A1AB678A47}")
  virtual int GetDropDownWidth() = 0;
};
/// Told by `ModalEditDone` when a modal edit ends.
struct FK_API IActivatable : IInterface {
  FK_INTERFACE(IActivatable, IInterface, "{C4BFC6CF-954A-5C4A-9B4D-2CF414D15C55}")
  virtual void Activated() = 0;
};

//===----------------------------------------------------------------------===//
// Design objects and selections
//===----------------------------------------------------------------------===//

/// A class reference as tool windows see it.
struct FK_API IClass : IInterface {
  FK_INTERFACE(IClass, IInterface, "{E4533D68-6360-5E45-8FDB-F2AB36E4A455}")
  virtual bool ClassNameIs(const String& Name) = 0;
  virtual String GetClassName() = 0;
  virtual String GetUnitName() = 0;
  /// A new wrapper of the parent class; null for the topmost class.
  virtual IPtr<IClass> GetClassParent() = 0;
};

/// Something that can be selected, seen without knowing that it is a persistent.
struct FK_API IDesignObject : IInterface {
  FK_INTERFACE(IDesignObject, IInterface, "{E52B7B61-21A9-560D-90DA-77FEC6BD0AA8}")
  /// Whether `Obj` is the very object behind this design object (an identity test).
  virtual bool Equals(TObject* Obj) = 0;
  /// Whether `Obj` stands for the same thing as this one.
  virtual bool Equals(const IPtr<IDesignObject>& Obj) = 0;
  virtual IPtr<IClass> GetClassType() = 0;
  virtual String GetClassName() = 0;
  virtual int GetComponentIndex() = 0;
  virtual String GetComponentName() = 0;
  virtual bool GetIsComponent() = 0;
  virtual String GetNamePath() = 0;
};
struct FK_API IDesignPersistent : IDesignObject {
  FK_INTERFACE(IDesignPersistent, IDesignObject, "{9A16FC91-4DCB-59DE-9FF1-CD8B2BC49913}")
  virtual TPersistent* GetPersistent() = 0;
};

/// An ordered list of selected persistents.
struct FK_API IDesignerSelections : IInterface {
  FK_INTERFACE(IDesignerSelections, IInterface, "{17E1F6E0-85B3-57DD-BF1D-ADAE6F1D53D5}")
  virtual int Add(TPersistent* Item) = 0;
  virtual bool Equals(const IPtr<IDesignerSelections>& List) = 0;
  virtual TPersistent* Get(int Index) = 0;
  virtual IPtr<IDesignObject> GetDesignObject(int Index) = 0;
  virtual int GetCount() = 0;
};

//===----------------------------------------------------------------------===//
// Notifications and windows
//===----------------------------------------------------------------------===//

/// What tool windows hear of every design surface.
struct FK_API IDesignNotification : IInterface {
  FK_INTERFACE(IDesignNotification, IInterface, "{1C6AAA88-6C9D-5500-9E24-6717FB4295C5}")
  virtual void ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) = 0;
  virtual void ItemInserted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) = 0;
  virtual void ItemsModified(const IPtr<IDesigner>& ADesigner) = 0;
  virtual void SelectionChanged(const IPtr<IDesigner>& ADesigner, const IPtr<IDesignerSelections>& ASelection) = 0;
  virtual void DesignerOpened(const IPtr<IDesigner>& ADesigner, bool AResurrecting) = 0;
  virtual void DesignerClosed(const IPtr<IDesigner>& ADesigner, bool AGoingDormant) = 0;
};
struct FK_API IDesignNotificationEx : IDesignNotification {
  FK_INTERFACE(IDesignNotificationEx, IDesignNotification, "{1737AE79-7016-5701-9936-83C6105D3088}")
  virtual void DescendantUpdated(const IPtr<IDesigner>& ADesigner) = 0;
};
struct FK_API IDesignNotificationViews : IDesignNotification {
  FK_INTERFACE(IDesignNotificationViews, IDesignNotification, "{18B99023-A98A-5ADA-933F-8C2F457DE15B}")
  virtual void ViewAdded(const IPtr<IDesigner>& ADesigner, const String& ViewName) = 0;
  virtual void ViewRemoved(const IPtr<IDesigner>& ADesigner, const String& ViewName) = 0;
};
struct FK_API IDesignWindow : IDesignNotification {
  FK_INTERFACE(IDesignWindow, IDesignNotification, "{4CE2A77C-91F0-5403-A5CA-6B5D00159758}")
  virtual void WindowHide() = 0;
  virtual void WindowShow() = 0;
};
/// A window's editing commands.
struct FK_API IEditHandler : IInterface {
  FK_INTERFACE(IEditHandler, IInterface, "{A826606C-9BCB-5082-BB53-552AC2FD5D2F}")
  virtual bool EditAction(TEditAction Action) = 0;
  virtual TEditState GetEditState() = 0;
};

//===----------------------------------------------------------------------===//
// Editors and custom modules
//===----------------------------------------------------------------------===//

struct FK_API IComponentEditor : IInterface {
  FK_INTERFACE(IComponentEditor, IInterface, "{AE6C9F50-01EE-59DC-9C25-003BED9CA62A}")
  virtual void Edit() = 0;
  virtual void ExecuteVerb(int Index) = 0;
  virtual String GetVerb(int Index) = 0;
  virtual int GetVerbCount() = 0;
  virtual void PrepareItem(int Index, const IPtr<IMenuItem>& AItem) = 0;
  virtual void Copy() = 0;
  virtual bool IsInInlined() = 0;
  virtual TComponent* GetComponent() = 0;
  virtual IPtr<IDesigner> GetDesigner() = 0;
};
struct FK_API IDefaultEditor : IComponentEditor {
  FK_INTERFACE(IDefaultEditor, IComponentEditor, "{D0E44C07-B5F1-5D21-9B82-F6AEF117F0CF}")
};
struct FK_API ISelectionEditor : IInterface {
  FK_INTERFACE(ISelectionEditor, IInterface, "{F5415FCD-6443-5F0A-8F51-B75E11156F74}")
  virtual void ExecuteVerb(int Index, const IPtr<IDesignerSelections>& List) = 0;
  virtual String GetVerb(int Index) = 0;
  virtual int GetVerbCount() = 0;
  virtual void PrepareItem(int Index, const IPtr<IMenuItem>& AItem) = 0;
  virtual void RequiresUnits(const TGetStrProc& Proc) = 0;
};
struct FK_API ISelectionPropertyFilter : IInterface {
  FK_INTERFACE(ISelectionPropertyFilter, IInterface, "{98BE89F4-53E8-58AE-AFBD-394EF7500940}")
  virtual void FilterProperties(const IPtr<IDesignerSelections>& ASelection,
                                const IPtr<IInterfaceList>& AProperties) = 0;
};
struct FK_API ISelectionEditorList : IInterface {
  FK_INTERFACE(ISelectionEditorList, IInterface, "{97008F2E-42EF-5A8F-86AF-366AF1043D4B}")
  virtual IPtr<ISelectionEditor> Get(int Index) = 0;
  virtual int GetCount() = 0;
};
/// What a framework adds to the modules of one root class.
struct FK_API ICustomModule : IInterface {
  FK_INTERFACE(ICustomModule, IInterface, "{4656889A-E824-5A3E-91E8-0900D7B735DE}")
  virtual TCustomModuleAttributes GetAttributes() = 0;
  virtual void ExecuteVerb(int Index) = 0;
  virtual String GetVerb(int Index) = 0;
  virtual int GetVerbCount() = 0;
  virtual void PrepareItem(int Index, const IPtr<IMenuItem>& AItem) = 0;
  virtual void Saving() = 0;
  virtual void ValidateComponent(TComponent* Component) = 0;
  virtual bool ValidateComponentClass(TClass ComponentClass) = 0;
  virtual bool Nestable() = 0;
};
struct FK_API IHostForm : IInterface {
  FK_INTERFACE(IHostForm, IInterface, "{C4795FD3-B0A0-56A4-A0D9-05ACC13271BF}")
};
/// Gives the object behind an interface.
struct FK_API IImplementation : IInterface {
  FK_INTERFACE(IImplementation, IInterface, "{A5FD06EC-EEA4-524E-9748-5F3495D98A78}")
  virtual TObject* GetInstance() = 0;
};
/// The alignment guidelines a component offers.
struct FK_API IComponentGuidelines : IInterface {
  FK_INTERFACE(IComponentGuidelines, IInterface, "{237413D7-F6B8-4B8D-B581-3CDC320CE854}")
  virtual int GetCount() = 0;
  virtual TDesignerGuideType GetDesignerGuideType(int Index) = 0;
  virtual int GetDesignerGuideOffset(int Index) = 0;
};

} // namespace formkit

#include "core/DesignIntfDesigner.h"
#include "core/DesignIntfClasses.h"
