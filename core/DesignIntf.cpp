//===- core/DesignIntf.cpp - The design contract -------------------------===//
#include "core/DesignIntf.h"

namespace formkit {

FK_RESOURCESTRING(SInvalidMethodData, "Invalid method type data");

bool GReferenceExpandable = true;
bool GShowReadOnlyProps = true;

//===----------------------------------------------------------------------===//
// Registration calls
//===----------------------------------------------------------------------===//

std::function<void(const IPtr<IDesignNotification>&)> RegisterDesignNotificationProc;
std::function<void(const IPtr<IDesignNotification>&)> UnregisterDesignNotificationProc;
std::function<void(int, TClass, TClass)> RegisterCustomModuleProc;
std::function<void(PTypeInfo, TClass, const String&, TClass)> RegisterPropertyEditorProc;
std::function<void(TClass, TClass)> SetPropertyEditorGroupProc;
std::function<void(const TPropertyMapperFunc&)> RegisterPropertyMapperProc;
std::function<void(TClass, TClass)> RegisterComponentEditorProc;
std::function<void(TClass, TClass)> RegisterSelectionEditorProc;
std::function<void(const String&, TClass, PTypeInfo, const String&)> RegisterPropertyInCategoryProc;
std::function<void(TDemandLoadState)> ForceDemandLoadStateProc;
std::function<void(bool, bool)> EnableDemandLoadReportProc;
std::function<void(const String&, TClass)> RegisterDragTargetProc;
std::function<void(TClass)> RegisterDesignDragObjectProc;
std::function<void(const IPtr<IInterface>&)> RegisterIDropTargetProc;
std::function<void(TClass, TClass)> RegisterComponentGuidelinesProc;

namespace {
/// Calls `Hook` when it is set: a registration made before its registry starts is lost.
template <class Hook, class... A> void Forward(const Hook& H, A&&... Args) {
  if (H) H(std::forward<A>(Args)...);
}
} // namespace

std::function<void(const IPtr<IDesignerSelections>&, TTypeKinds, const IPtr<IDesigner>&, const TGetPropProc&,
                   const TPropertyEditorFilterFunc&)>
    GetComponentPropertiesProc;

void GetComponentProperties(const IPtr<IDesignerSelections>& Selection, TTypeKinds Kinds,
                            const IPtr<IDesigner>& Designer, const TGetPropProc& Proc,
                            const TPropertyEditorFilterFunc& Filter) {
  Forward(GetComponentPropertiesProc, Selection, Kinds, Designer, Proc, Filter);
}

void RegisterDesignNotification(const IPtr<IDesignNotification>& N) { Forward(RegisterDesignNotificationProc, N); }
void UnregisterDesignNotification(const IPtr<IDesignNotification>& N) { Forward(UnregisterDesignNotificationProc, N); }
void RegisterCustomModule(TClass Base, TClass Module) { Forward(RegisterCustomModuleProc, CurrentGroup, Base, Module); }
void RegisterPropertyEditor(PTypeInfo Type, TClass Class, const String& Name, TClass Editor) {
  Forward(RegisterPropertyEditorProc, Type, Class, Name, Editor);
}
void UnlistPublishedProperty(TClass ComponentClass, const String& PropertyName) {
  PPropInfo Prop = GetPropInfo(ComponentClass->TypeInfo(), PropertyName);
  if (Prop) RegisterPropertyEditor(Prop->PropType(), ComponentClass, PropertyName, nullptr);
}
void SetPropertyEditorGroup(TClass Editor, TClass Group) { Forward(SetPropertyEditorGroupProc, Editor, Group); }
void RegisterPropertyMapper(const TPropertyMapperFunc& Mapper) { Forward(RegisterPropertyMapperProc, Mapper); }
void RegisterComponentEditor(TClass Class, TClass Editor) { Forward(RegisterComponentEditorProc, Class, Editor); }
void RegisterSelectionEditor(TClass Class, TClass Editor) { Forward(RegisterSelectionEditorProc, Class, Editor); }
void RegisterPropertyInCategory(const String& Category, TClass Class, PTypeInfo Type, const String& Name) {
  Forward(RegisterPropertyInCategoryProc, Category, Class, Type, Name);
}
void RegisterPropertyInCategory(const String& Category, const String& Name) {
  RegisterPropertyInCategory(Category, nullptr, nullptr, Name);
}
void RegisterPropertyInCategory(const String& Category, TClass Class, const String& Name) {
  RegisterPropertyInCategory(Category, Class, nullptr, Name);
}
void RegisterPropertyInCategory(const String& Category, PTypeInfo Type, const String& Name) {
  RegisterPropertyInCategory(Category, nullptr, Type, Name);
}
void RegisterPropertyInCategory(const String& Category, PTypeInfo Type) {
  RegisterPropertyInCategory(Category, nullptr, Type, String());
}
void RegisterPropertiesInCategory(const String& Category, TClass Class, const std::vector<String>& Names) {
  for (const String& Name : Names) RegisterPropertyInCategory(Category, Class, nullptr, Name);
}
void RegisterPropertiesInCategory(const String& Category, PTypeInfo Type, const std::vector<String>& Names) {
  for (const String& Name : Names) RegisterPropertyInCategory(Category, nullptr, Type, Name);
}
void RegisterPropertiesInCategory(const String& Category, const std::vector<TCategoryFilter>& Filters) {
  for (std::size_t I = 0; I < Filters.size(); ++I) {
    const TCategoryFilter& F = Filters[I];
    switch (F.VType) {
    case TCategoryFilter::vtPointer: RegisterPropertyInCategory(Category, nullptr, F.Type, String()); break;
    case TCategoryFilter::vtClass: RegisterPropertyInCategory(Category, F.Class, nullptr, String()); break;
    case TCategoryFilter::vtAnsiString:
    case TCategoryFilter::vtUnicodeString: RegisterPropertyInCategory(Category, nullptr, nullptr, F.Name); break;
    default: throw Exception(sInvalidFilter, static_cast<int>(I), F.VType);
    }
  }
}
void ForceDemandLoadState(TDemandLoadState State) { Forward(ForceDemandLoadStateProc, State); }
void EnableDemandLoadReport(bool Enable, bool Detailed) { Forward(EnableDemandLoadReportProc, Enable, Detailed); }
void RegisterDragTarget(const String& Source, TClass Target) { Forward(RegisterDragTargetProc, Source, Target); }
void RegisterDesignDragObject(TClass Class) { Forward(RegisterDesignDragObjectProc, Class); }
void RegisterIDropTarget(const IPtr<IInterface>& Target) { Forward(RegisterIDropTargetProc, Target); }
void RegisterComponentGuidelines(TClass Class, TClass Guidelines) {
  Forward(RegisterComponentGuidelinesProc, Class, Guidelines);
}

//===----------------------------------------------------------------------===//
// TEventInfo
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TEventInfo, "DesignIntf") {}

TEventInfo::TEventInfo(PPropInfo PropInfo) { Initialize(GetTypeData(PropInfo->PropType())); }

TEventInfo::TEventInfo(const TTypeData* TypeData) { Initialize(TypeData); }

void TEventInfo::Initialize(const TTypeData* TypeData) {
  if (!TypeData) throw EArgumentException(SInvalidMethodData);
  const auto& Bytes = TypeData->MethodData;
  size_t Pos = 0;
  auto Byte = [&]() -> std::uint8_t {
    if (Pos >= Bytes.size()) throw EArgumentException(SInvalidMethodData);
    return Bytes[Pos++];
  };
  auto ShortString = [&]() {
    std::uint8_t Len = Byte();
    if (Pos + Len > Bytes.size()) throw EArgumentException(SInvalidMethodData);
    String S(reinterpret_cast<const char*>(Bytes.data() + Pos), Len);
    Pos += Len;
    return S;
  };
  FMethodKind = Byte() & ~std::uint8_t(16);
  size_t Count = Byte();
  FParamNames.resize(Count);
  FParamTypes.resize(Count);
  FParamFlags.resize(Count);
  for (size_t I = 0; I < Count; ++I) {
    FParamFlags[I] = Byte();
    FParamNames[I] = ShortString();
    FParamTypes[I] = ShortString();
  }
  FResultType = ShortString();
}

void TEventInfo::CheckIndex(int Index) const {
  if (Index < 0 || Index >= static_cast<int>(FParamNames.size())) throw EListError(SListIndexError, Index);
}

String TEventInfo::GetParamName(int Index) {
  CheckIndex(Index);
  return FParamNames[static_cast<size_t>(Index)];
}

String TEventInfo::GetParamType(int Index) {
  CheckIndex(Index);
  return FParamTypes[static_cast<size_t>(Index)];
}

TParamFlags TEventInfo::GetParamFlags(int Index) {
  CheckIndex(Index);
  return TParamFlags::FromMask(FParamFlags[static_cast<size_t>(Index)]);
}

//===----------------------------------------------------------------------===//
// Wrappers and selections
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TClassWrapper, "DesignIntf") {}

IPtr<IClass> TClassWrapper::GetClassParent() {
  if (!FClass->Parent) return nullptr;
  return NewAs<IClass, TClassWrapper>(FClass->Parent);
}

FK_IMPLEMENT(TDesignObject, "DesignIntf") {}

bool TDesignObject::Equals(const IPtr<IDesignObject>& Obj) {
  IPtr<IDesignPersistent> Other = QueryAs<IDesignPersistent>(Obj);
  return Other && Other->GetPersistent() == FPersistent;
}

IPtr<IClass> TDesignObject::GetClassType() { return NewAs<IClass, TClassWrapper>(FPersistent->ClassType()); }

int TDesignObject::GetComponentIndex() {
  auto* C = dynamic_cast<TComponent*>(FPersistent);
  return C ? C->ComponentIndex() : -1;
}

String TDesignObject::GetComponentName() {
  auto* C = dynamic_cast<TComponent*>(FPersistent);
  return C ? C->Name() : FPersistent->ClassName();
}

bool TDesignObject::GetIsComponent() { return dynamic_cast<TComponent*>(FPersistent) != nullptr; }

IPtr<IDesignObject> PersistentToDesignObject(TPersistent* Persistent) {
  return NewAs<IDesignObject, TDesignObject>(Persistent);
}

FK_IMPLEMENT(TDesignerSelections, "DesignIntf") {}

TDesignerSelections::TDesignerSelections(const IPtr<IDesignerSelections>& Source) {
  if (!Source) return;
  for (int I = 0, N = Source->GetCount(); I < N; ++I) FList.push_back(Source->Get(I));
}

int TDesignerSelections::Add(TPersistent* Item) {
  FList.push_back(Item);
  return static_cast<int>(FList.size()) - 1;
}

bool TDesignerSelections::Equals(const IPtr<IDesignerSelections>& List) {
  if (!List || List->GetCount() != GetCount()) return false;
  for (int I = 0; I < GetCount(); ++I)
    if (List->Get(I) != FList[static_cast<size_t>(I)]) return false;
  return true;
}

TPersistent* TDesignerSelections::Get(int Index) {
  if (Index < 0 || Index >= GetCount()) throw EListError(SListIndexError, Index);
  return FList[static_cast<size_t>(Index)];
}

IPtr<IDesignObject> TDesignerSelections::GetDesignObject(int Index) { return PersistentToDesignObject(Get(Index)); }

IPtr<IDesignerSelections> CreateSelectionList() { return NewAs<IDesignerSelections, TDesignerSelections>(); }

//===----------------------------------------------------------------------===//
// Abstract bases
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBasePropertyEditor, "DesignIntf") {}
void TBasePropertyEditor::Create(const IPtr<IDesigner>&, int) {}
FK_IMPLEMENT(TBaseComponentEditor, "DesignIntf") {}
void TBaseComponentEditor::Create(TComponent*, const IPtr<IDesigner>&) {}
FK_IMPLEMENT(TBaseSelectionEditor, "DesignIntf") {}
void TBaseSelectionEditor::Create(const IPtr<IDesigner>&) {}
FK_IMPLEMENT(TBaseCustomModule, "DesignIntf") {}
void TBaseCustomModule::Create(TComponent*, const IPtr<IDesigner>&) {}
FK_IMPLEMENT(TDragTarget, "DesignIntf") {}
FK_IMPLEMENT(TBaseComponentGuidelines, "DesignIntf") {}
void TBaseComponentGuidelines::Create(const IPtr<IDesigner>& ADesigner) { FDesigner = ADesigner; }

} // namespace formkit
