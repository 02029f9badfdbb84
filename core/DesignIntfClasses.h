//===- core/DesignIntfClasses.h - Registration calls and small classes ---===//
//
// The global registration calls of the design contract, each forwarding to a
// hook variable and doing nothing while the hook is null; the concrete classes
// `TEventInfo`, `TDesignObject`, `TClassWrapper`, `TDesignerSelections`; the
// abstract editor and module bases; the unit's resource strings. Included by
// DesignIntf.h.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// Registration calls and their hooks
//===----------------------------------------------------------------------===//

/// Maps a property of an object to an editor class; null to decline.
using TPropertyMapperFunc = std::function<TClass(TPersistent* Obj, PPropInfo PropInfo)>;

FK_API extern std::function<void(const IPtr<IDesignNotification>&)> RegisterDesignNotificationProc;
FK_API extern std::function<void(const IPtr<IDesignNotification>&)> UnregisterDesignNotificationProc;
FK_API extern std::function<void(int Group, TClass ComponentBaseClass, TClass CustomModuleClass)>
    RegisterCustomModuleProc;
FK_API extern std::function<void(PTypeInfo PropertyType, TClass ComponentClass, const String& PropertyName,
                                 TClass EditorClass)>
    RegisterPropertyEditorProc;
FK_API extern std::function<void(TClass EditorClass, TClass GroupClass)> SetPropertyEditorGroupProc;
FK_API extern std::function<void(const TPropertyMapperFunc& Mapper)> RegisterPropertyMapperProc;
FK_API extern std::function<void(TClass ComponentClass, TClass ComponentEditor)> RegisterComponentEditorProc;
FK_API extern std::function<void(TClass AClass, TClass AEditor)> RegisterSelectionEditorProc;
FK_API extern std::function<void(const String& CategoryName, TClass ComponentClass, PTypeInfo PropertyType,
                                 const String& PropertyName)>
    RegisterPropertyInCategoryProc;
FK_API extern std::function<void(TDemandLoadState State)> ForceDemandLoadStateProc;
FK_API extern std::function<void(bool Enable, bool Detailed)> EnableDemandLoadReportProc;
FK_API extern std::function<void(const String& SourceName, TClass TargetClass)> RegisterDragTargetProc;
FK_API extern std::function<void(TClass DragObjectClass)> RegisterDesignDragObjectProc;
FK_API extern std::function<void(const IPtr<IInterface>& DropTarget)> RegisterIDropTargetProc;
FK_API extern std::function<void(TClass ComponentClass, TClass GuidelinesClass)> RegisterComponentGuidelinesProc;

/// The entry of the property registry: hands the editors of the properties that `Selection`
/// shares, of the kinds `Kinds`, to `Proc`. Set by the property registry when it starts.
FK_API extern std::function<void(const IPtr<IDesignerSelections>& Selection, TTypeKinds Kinds,
                                 const IPtr<IDesigner>& Designer, const TGetPropProc& Proc,
                                 const TPropertyEditorFilterFunc& Filter)>
    GetComponentPropertiesProc;

/// Calls `GetComponentPropertiesProc` when it is set.
FK_API void GetComponentProperties(const IPtr<IDesignerSelections>& Selection, TTypeKinds Kinds,
                                   const IPtr<IDesigner>& Designer, const TGetPropProc& Proc,
                                   const TPropertyEditorFilterFunc& Filter = nullptr);

/// Adds a listener to every design surface's notifications.
FK_API void RegisterDesignNotification(const IPtr<IDesignNotification>& DesignNotification);
FK_API void UnregisterDesignNotification(const IPtr<IDesignNotification>& DesignNotification);
/// Registers what a framework adds to modules whose root descends from `ComponentBaseClass`.
FK_API void RegisterCustomModule(TClass ComponentBaseClass, TClass CustomModuleClass);
/// Registers `EditorClass` for properties of `PropertyType`; a null `ComponentClass` or an
/// empty `PropertyName` matches any.
FK_API void RegisterPropertyEditor(PTypeInfo PropertyType, TClass ComponentClass, const String& PropertyName,
                                   TClass EditorClass);
/// Hides a published property from the inspector; nothing when it does not exist.
FK_API void UnlistPublishedProperty(TClass ComponentClass, const String& PropertyName);
FK_API void SetPropertyEditorGroup(TClass EditorClass, TClass GroupClass);
FK_API void RegisterPropertyMapper(const TPropertyMapperFunc& Mapper);
FK_API void RegisterComponentEditor(TClass ComponentClass, TClass ComponentEditor);
FK_API void RegisterSelectionEditor(TClass AClass, TClass AEditor);
FK_API void RegisterPropertyInCategory(const String& CategoryName, TClass ComponentClass, PTypeInfo PropertyType,
                                       const String& PropertyName);
/// The shorter forms: what is not given matches any (a class, a type) or every name.
FK_API void RegisterPropertyInCategory(const String& CategoryName, const String& PropertyName);
FK_API void RegisterPropertyInCategory(const String& CategoryName, TClass ComponentClass, const String& PropertyName);
FK_API void RegisterPropertyInCategory(const String& CategoryName, PTypeInfo PropertyType, const String& PropertyName);
FK_API void RegisterPropertyInCategory(const String& CategoryName, PTypeInfo PropertyType);
/// One category registration per filter.
FK_API void RegisterPropertiesInCategory(const String& CategoryName, TClass ComponentClass,
                                         const std::vector<String>& PropertyNames);
FK_API void RegisterPropertiesInCategory(const String& CategoryName, PTypeInfo PropertyType,
                                         const std::vector<String>& PropertyNames);

/// One element of a mixed list of category filters, with its value kind as the platform
/// numbers it: a type (5, a pointer), a class (8) or a name (17, or 11 for a narrow
/// string). Other kinds can be made, and are refused.
struct FK_API TCategoryFilter {
  static constexpr int vtInteger = 0, vtBoolean = 1, vtPointer = 5, vtClass = 8, vtAnsiString = 11,
                       vtUnicodeString = 17;
  int VType = vtUnicodeString;
  PTypeInfo Type = nullptr;
  TClass Class = nullptr;
  String Name;
  TCategoryFilter(PTypeInfo AType) : VType(vtPointer), Type(AType) {}
  TCategoryFilter(TClass AClass) : VType(vtClass), Class(AClass) {}
  TCategoryFilter(String AName) : Name(std::move(AName)) {}
  TCategoryFilter(const char* AName) : Name(AName) {}
  /// An element of another kind, such as a number.
  TCategoryFilter(int Kind, std::nullptr_t) : VType(Kind) {}
};
/// One registration per element, in order: a type, a class or a name. Raises `Exception`
/// `sInvalidFilter` with the index and the kind of the first element of another kind; the
/// elements before it stay registered.
FK_API void RegisterPropertiesInCategory(const String& CategoryName, const std::vector<TCategoryFilter>& Filters);
FK_API void ForceDemandLoadState(TDemandLoadState State);
FK_API void EnableDemandLoadReport(bool Enable, bool Detailed);
FK_API void RegisterDragTarget(const String& SourceName, TClass TargetClass);
FK_API void RegisterDesignDragObject(TClass DragObjectClass);
FK_API void RegisterIDropTarget(const IPtr<IInterface>& DropTarget);
FK_API void RegisterComponentGuidelines(TClass ComponentClass, TClass GuidelinesClass);

//===----------------------------------------------------------------------===//
// Small concrete classes
//===----------------------------------------------------------------------===//

/// A parsed copy of the signature of a method-pointer type.
class FK_API TEventInfo : public TInterfacedObject, public IEventInfo {
  FK_CLASS(TEventInfo, TInterfacedObject)
  FK_INTERFACES(IEventInfo)

  TEventInfo() = default;
  /// From the type data of a method-pointer property's type.
  explicit TEventInfo(PPropInfo PropInfo);
  /// From method type data directly.
  explicit TEventInfo(const TTypeData* TypeData);

  TMethodKind GetMethodKind() override { return static_cast<TMethodKind>(FMethodKind); }
  int GetParamCount() override { return static_cast<int>(FParamNames.size()); }
  /// Raise `EListError` for an index out of range.
  String GetParamName(int Index) override;
  String GetParamType(int Index) override;
  TParamFlags GetParamFlags(int Index) override;
  String GetResultType() override { return FResultType; }

protected:
  /// Parses the method layout; raises `EArgumentException` "Invalid method type data"
  /// when it is cut short.
  void Initialize(const TTypeData* TypeData);

private:
  void CheckIndex(int Index) const;
  std::uint8_t FMethodKind = 0;
  std::vector<String> FParamNames;
  std::vector<String> FParamTypes;
  std::vector<std::uint8_t> FParamFlags;
  String FResultType;
};

/// Wraps a class reference for tool windows.
class FK_API TClassWrapper : public TInterfacedObject, public IClass {
  FK_CLASS(TClassWrapper, TInterfacedObject)
  FK_INTERFACES(IClass)
  explicit TClassWrapper(TClass AClass = nullptr) : FClass(AClass) {}
  bool ClassNameIs(const String& Name) override { return FClass->ClassNameIs(Name); }
  String GetClassName() override { return FClass->ClassName; }
  String GetUnitName() override { return FClass->UnitName; }
  IPtr<IClass> GetClassParent() override;

private:
  TClass FClass;
};

/// Wraps one persistent, so that tool windows can treat it as a design object. Does not
/// own the persistent.
class FK_API TDesignObject : public TInterfacedObject, public IDesignPersistent {
  FK_CLASS(TDesignObject, TInterfacedObject)
  FK_INTERFACES(IDesignPersistent)
  explicit TDesignObject(TPersistent* APersistent = nullptr) : FPersistent(APersistent) {}
  /// The identity test of every object: whether `Obj` is this very wrapper. The wrapped
  /// persistent, or another wrapper of it, is not; compare wrappers through the
  /// `IDesignObject` form.
  bool Equals(TObject* Obj) override { return Obj == static_cast<TObject*>(this); }
  /// Whether `Obj` answers to `IDesignPersistent` and wraps the same instance.
  bool Equals(const IPtr<IDesignObject>& Obj) override;
  IPtr<IClass> GetClassType() override;
  String GetClassName() override { return FPersistent->ClassName(); }
  int GetComponentIndex() override;
  String GetComponentName() override;
  bool GetIsComponent() override;
  String GetNamePath() override { return FPersistent->GetNamePath(); }
  TPersistent* GetPersistent() override { return FPersistent; }

private:
  TPersistent* FPersistent;
};

/// A new design object for `Persistent`.
FK_API IPtr<IDesignObject> PersistentToDesignObject(TPersistent* Persistent);

/// An ordered list of persistents; owns nothing.
class FK_API TDesignerSelections : public TInterfacedObject, public IDesignerSelections {
  FK_CLASS(TDesignerSelections, TInterfacedObject)
  FK_INTERFACES(IDesignerSelections)
  TDesignerSelections() = default;
  /// A copy of `Source`, element by element in order.
  explicit TDesignerSelections(const IPtr<IDesignerSelections>& Source);

  /// Appends without a duplicate check.
  int Add(TPersistent* Item) override;
  /// Same count and, position by position, the same references.
  bool Equals(const IPtr<IDesignerSelections>& List) override;
  /// Raises `EListError` for an index out of range.
  TPersistent* Get(int Index) override;
  /// A new wrapper at each call.
  IPtr<IDesignObject> GetDesignObject(int Index) override;
  int GetCount() override { return static_cast<int>(FList.size()); }

private:
  std::vector<TPersistent*> FList;
};

/// A new, empty selection list.
FK_API IPtr<IDesignerSelections> CreateSelectionList();

//===----------------------------------------------------------------------===//
// Abstract bases of editors and modules
//===----------------------------------------------------------------------===//

/// The base of property editors; creation goes through the virtual constructor.
class FK_API TBasePropertyEditor : public TInterfacedObject {
  FK_CLASS(TBasePropertyEditor, TInterfacedObject)
  virtual void Initialize() = 0;
  virtual void SetPropEntry(int Index, TPersistent* AInstance, PPropInfo APropInfo) = 0;
  virtual void Create(const IPtr<IDesigner>& ADesigner, int APropCount);
};

class FK_API TBaseComponentEditor : public TInterfacedObject {
  FK_CLASS(TBaseComponentEditor, TInterfacedObject)
  virtual void Create(TComponent* AComponent, const IPtr<IDesigner>& ADesigner);
};

class FK_API TBaseSelectionEditor : public TInterfacedObject {
  FK_CLASS(TBaseSelectionEditor, TInterfacedObject)
  virtual void Create(const IPtr<IDesigner>& ADesigner);
};

class FK_API TBaseCustomModule : public TInterfacedObject {
  FK_CLASS(TBaseCustomModule, TInterfacedObject)
  virtual void Create(TComponent* ARoot, const IPtr<IDesigner>& ADesigner);
  /// The root class this custom module designs; null in the base.
  virtual TClass DesignClass() const { return nullptr; }
};

class FK_API TDragTarget : public TObject {
  FK_CLASS(TDragTarget, TObject)
  explicit TDragTarget(const IPtr<IDesigner>& ADesigner = nullptr) : FDesigner(ADesigner) {}
  virtual bool DragOver(TObject* Target, TObject* Source, int X, int Y) = 0;
  virtual void DragDrop(TObject* Target, TObject* Source, int X, int Y) = 0;
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }

protected:
  IPtr<IDesigner> FDesigner;
};

/// The base of the guides a component offers on a surface; made from a class reference
/// through the virtual constructor (`NewFromClass`), then initialised for one component.
class FK_API TBaseComponentGuidelines : public TInterfacedObject {
  FK_CLASS(TBaseComponentGuidelines, TInterfacedObject)
  /// The virtual constructor: keeps `ADesigner`, which may be null.
  virtual void Create(const IPtr<IDesigner>& ADesigner);
  /// Binds the guides to `AComponent`, whose guides are given in the coordinates of
  /// `AContainer`. Neither is owned.
  virtual void Initialize(TComponent* AComponent, TComponent* AContainer) = 0;

protected:
  IPtr<IDesigner> FDesigner;
};

/// Makes a counted object of `Class` (a descendant of `Base`) and runs its virtual
/// constructor with `Args`; the object dies with the returned reference.
template <class Base, class... A> IPtr<Base> NewFromClass(TClass Class, A&&... Args) {
  auto* Obj = static_cast<Base*>(Class->NewInstance());
  IPtr<Base> Result = IPtr<Base>::Adopt(Obj); // owns the construction reference
  Obj->Create(std::forward<A>(Args)...);
  Obj->AfterConstruction();
  return Result;
}

//===----------------------------------------------------------------------===//
// Resource strings
//===----------------------------------------------------------------------===//

FK_RESOURCESTRING(sAppearanceCategoryName, "Appearance");
FK_RESOURCESTRING(sBehaviorCategoryName, "Behavior");
FK_RESOURCESTRING(sDesignCategoryName, "Design");
FK_RESOURCESTRING(sFocusCategoryName, "Focus");
FK_RESOURCESTRING(sWindowStyleName, "Window Style");
FK_RESOURCESTRING(sPropertyChangeCategoryName, "Property Changed");
FK_RESOURCESTRING(sMouseCategoryName, "Mouse");
FK_RESOURCESTRING(sKeyCategoryName, "Key");
FK_RESOURCESTRING(sActionCategoryName, "Action");
FK_RESOURCESTRING(sDataCategoryName, "Data");
FK_RESOURCESTRING(sDatabaseCategoryName, "Database");
FK_RESOURCESTRING(sDragNDropCategoryName, "Drag Drop/Docking");
FK_RESOURCESTRING(sHelpCategoryName, "Help and Hints");
FK_RESOURCESTRING(sLayoutCategoryName, "Layout");
FK_RESOURCESTRING(sLegacyCategoryName, "Legacy");
FK_RESOURCESTRING(sLinkageCategoryName, "Linkage");
FK_RESOURCESTRING(sLocaleCategoryName, "Locale");
FK_RESOURCESTRING(sLocalizableCategoryName, "Localizable");
FK_RESOURCESTRING(sMiscellaneousCategoryName, "Miscellaneous");
FK_RESOURCESTRING(sVisualCategoryName, "Visual");
FK_RESOURCESTRING(sInputCategoryName, "Input");
FK_RESOURCESTRING(sInvalidFilter, "Property filters may only be name, class or type based (%d:%d)");

} // namespace formkit
