//===- editors/EditorRegistry.cpp - Where design packages register editors ===//
#include "editors/EditorRegistry.h"
#include "editors/PropertyCategories.h"

#include "core/DesignCore.h"
#include "core/EditorGroups.h"
#include "core/root/ComponentRoot.h"
#include "editors/ComponentEditors.h"
#include "editors/ComponentGuidelines.h"
#include "editors/ReferenceEditors.h"
#include "editors/ScalarEditors.h"
#include "editors/SelectionEditors.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TSelectionEditorDefinition, "DesignEditors") {}
FK_IMPLEMENT(TPropInfoList, "DesignEditors") {}

namespace {

/// Every list of the registries, and the group numbers in use.
struct TRegistryLists {
  std::deque<TPropertyClassRec> PropertyClasses;
  std::deque<TPropertyMapperRec> PropertyMappers;
  std::deque<TComponentClassRec> ComponentClasses;
  std::vector<std::unique_ptr<TSelectionEditorDefinition>> SelectionEditors;
  /// Bit n set: group n is in use.
  std::vector<bool> EditorGroups;
};

TRegistryLists& Lists() {
  static TRegistryLists* L = new TRegistryLists; // immortal: a package may unload during teardown
  return *L;
}

/// Removes every element of `List` that `Drop` chooses, keeping the order of the rest.
template <class List, class Pred> void DropWhere(List& L, Pred&& Drop) {
  L.erase(std::remove_if(L.begin(), L.end(), Drop), L.end());
}

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

void RegisterPropertyEditorEntry(PTypeInfo PropertyType, TClass ComponentClass, const String& PropertyName,
                                 TClass EditorClass) {
  TPropertyClassRec Rec;
  Rec.Group = CurrentGroup;
  Rec.PropertyType = PropertyType;
  Rec.ComponentClass = ComponentClass;
  Rec.EditorClass = EditorClass;
  // A name without a class is dropped: the record then serves every property of the type.
  if (ComponentClass) Rec.PropertyName = PropertyName;
  Lists().PropertyClasses.push_front(std::move(Rec));
}

void SetPropertyEditorGroupEntry(TClass EditorClass, TClass GroupClass) {
  for (TPropertyClassRec& Rec : Lists().PropertyClasses)
    if (Rec.EditorClass == EditorClass) {
      Rec.ClassGroup = ClassGroupOf(GroupClass);
      return;
    }
}

void RegisterPropertyMapperEntry(const TPropertyMapperFunc& Mapper) {
  Lists().PropertyMappers.push_front({CurrentGroup, Mapper});
}

void RegisterComponentEditorEntry(TClass ComponentClass, TClass EditorClass) {
  Lists().ComponentClasses.push_front({CurrentGroup, ComponentClass, EditorClass});
}

void RegisterSelectionEditorEntry(TClass AClass, TClass AEditor) {
  Lists().SelectionEditors.push_back(std::make_unique<TSelectionEditorDefinition>(AClass, AEditor));
}

//===----------------------------------------------------------------------===//
// Matching a property with a registration
//===----------------------------------------------------------------------===//

TClass ClassOfType(PTypeInfo T) { return GetTypeData(T)->ClassRef; }

/// Both class types, and `T`'s class descends from `Base`'s.
bool ClassTypeInherits(PTypeInfo T, PTypeInfo Base) {
  if (T->Kind != tkClass || Base->Kind != tkClass) return false;
  TClass C = ClassOfType(T);
  TClass B = ClassOfType(Base);
  return C && B && C->InheritsFrom(B);
}

/// Both interface types, and `Target` is `T` or reached from it through parent links.
bool InterfaceTypeInherits(PTypeInfo T, PTypeInfo Target) {
  if (T->Kind != tkInterface || Target->Kind != tkInterface) return false;
  for (PTypeInfo I = T; I; I = GetTypeData(I)->IntfParent ? GetTypeData(I)->IntfParent() : nullptr)
    if (I == Target) return true;
  return false;
}

bool RecordServes(const TPropertyClassRec& P, PTypeInfo T, PPropInfo Prop, TPersistent* Obj) {
  bool TypeFits = P.PropertyType == T || ClassTypeInherits(T, P.PropertyType) || InterfaceTypeInherits(T, P.PropertyType);
  if (!TypeFits) return false;
  if (P.ComponentClass && !Obj->InheritsFrom(P.ComponentClass)) return false;
  if (P.ClassGroup && P.ClassGroup != ClassGroupOf(Obj)) return false;
  return P.PropertyName.empty() || SameText(P.PropertyName, Prop->Name);
}

/// Whether `P` replaces the best record so far, `C`. Any one test suffices, and each looks
/// only at the pair at hand: this is no ranking, and two records may each beat the other.
bool Replaces(const TPropertyClassRec& P, const TPropertyClassRec& C, PTypeInfo T) {
  if (!C.ComponentClass && P.ComponentClass) return true;
  if (C.PropertyName.empty() && !P.PropertyName.empty()) return true;
  if (C.PropertyType != T && P.PropertyType == T) return true;
  if (P.PropertyType != C.PropertyType &&
      (ClassTypeInherits(P.PropertyType, C.PropertyType) || InterfaceTypeInherits(P.PropertyType, C.PropertyType)))
    return true;
  return P.ComponentClass && C.ComponentClass && P.ComponentClass != C.ComponentClass &&
         P.ComponentClass->InheritsFrom(C.ComponentClass);
}

} // namespace

//===----------------------------------------------------------------------===//
// Public lists and records
//===----------------------------------------------------------------------===//

const std::deque<TPropertyClassRec>& PropertyClassList() { return Lists().PropertyClasses; }
const std::deque<TPropertyMapperRec>& PropertyMapperList() { return Lists().PropertyMappers; }
const std::deque<TComponentClassRec>& ComponentClassList() { return Lists().ComponentClasses; }
const std::vector<std::unique_ptr<TSelectionEditorDefinition>>& SelectionEditorDefinitions() {
  return Lists().SelectionEditors;
}

TSelectionEditorDefinition::TSelectionEditorDefinition(TClass AClass, TSelectionEditorClass AEditor)
    : FGroup(CurrentGroup), FClass(AClass), FEditor(AEditor) {}

bool TSelectionEditorDefinition::Matches(TClass AClass) const { return AClass && FClass && AClass->InheritsFrom(FClass); }

//===----------------------------------------------------------------------===//
// Groups
//===----------------------------------------------------------------------===//

int NewEditorGroup() {
  std::vector<bool>& Bits = Lists().EditorGroups;
  auto Free = std::find(Bits.begin(), Bits.end(), false);
  int Group = static_cast<int>(Free - Bits.begin());
  if (Free == Bits.end()) Bits.push_back(true);
  else *Free = true;
  CurrentGroup = Group;
  return Group;
}

void FreeEditorGroup(int Group) {
  TRegistryLists& L = Lists();
  auto OfGroup = [Group](const auto& Rec) { return Rec.Group == Group; };
  DropWhere(L.PropertyClasses, OfGroup);
  DropWhere(L.ComponentClasses, OfGroup);
  DropWhere(L.PropertyMappers, OfGroup);
  DropWhere(L.SelectionEditors, [Group](const auto& Def) { return Def->Group() == Group; });
  FreeComponentGuidelinesGroup(Group);
  NotifyGroupChangeSubscribers(Group);
  if (Group >= 0 && static_cast<size_t>(Group) < L.EditorGroups.size()) L.EditorGroups[static_cast<size_t>(Group)] = false;
}

//===----------------------------------------------------------------------===//
// Choosing editors
//===----------------------------------------------------------------------===//

TPropertyEditorClass DefaultEditorClassOf(TTypeKind Kind) {
  switch (Kind) {
  case tkInteger: return TIntegerProperty::StaticClass();
  case tkChar: return TCharProperty::StaticClass();
  case tkEnumeration: return TEnumProperty::StaticClass();
  case tkFloat: return TFloatProperty::StaticClass();
  case tkString:
  case tkLString:
  case tkUString: return TStringProperty::StaticClass();
  case tkSet: return TSetProperty::StaticClass();
  case tkClass: return TClassProperty::StaticClass();
  case tkMethod: return TMethodProperty::StaticClass();
  case tkWChar: return TWideCharProperty::StaticClass();
  case tkWString: return TWideStringProperty::StaticClass();
  case tkVariant: return TVariantProperty::StaticClass();
  case tkInterface: return TInterfaceProperty::StaticClass();
  case tkInt64: return TInt64Property::StaticClass();
  default: return nullptr; // unknown, arrays, records, class references, pointers, procedures
  }
}

TPropertyEditorClass GetEditorClass(PPropInfo PropInfo, TPersistent* Obj) {
  for (const TPropertyMapperRec& M : Lists().PropertyMappers)
    if (TClass Mapped = M.Mapper ? M.Mapper(Obj, PropInfo) : nullptr) return Mapped;
  PTypeInfo T = PropInfo->PropType();
  const TPropertyClassRec* Best = nullptr;
  for (const TPropertyClassRec& P : Lists().PropertyClasses) {
    if (!RecordServes(P, T, PropInfo, Obj)) continue;
    if (!Best || Replaces(P, *Best, T)) Best = &P;
  }
  return Best ? Best->EditorClass : DefaultEditorClassOf(T->Kind);
}

TNewPropertyEditor NewPropertyEditor(TPropertyEditorClass EditorClass, const IPtr<IDesigner>& Designer,
                                     int PropCount) {
  detail::RequireEditorClass(EditorClass, TBasePropertyEditor::StaticClass(), "property editor");
  TNewPropertyEditor Result;
  Result.Editor = NewFromClass<TBasePropertyEditor>(EditorClass, Designer, PropCount);
  Result.Prop = CastAs<IProperty>(Result.Editor.Get());
  return Result;
}

//===----------------------------------------------------------------------===//
// TPropInfoList
//===----------------------------------------------------------------------===//

TPropInfoList::TPropInfoList(TPersistent* Instance, TTypeKinds Filter) {
  PTypeInfo Info = Instance->ClassType()->TypeInfo();
  if (!Info) return;
  FList.reserve(static_cast<size_t>(GetPropList(Info, Filter, nullptr)));
  GetPropList(Info, Filter, &FList, true);
}

bool TPropInfoList::Contains(PPropInfo P) const {
  for (PPropInfo Entry : FList)
    if (Entry->PropType() == P->PropType() && Entry->Name.size() == P->Name.size() && SameText(Entry->Name, P->Name))
      return true;
  return false;
}

void TPropInfoList::Delete(int Index) { FList.erase(FList.begin() + Index); }

void TPropInfoList::Intersect(const TPropInfoList& List) {
  if (FList == List.FList) return; // the same records: every entry is contained
  // Both lists are sorted by name without regard to case, so one merge finds the entries
  // of the same name; of those, one of the same type keeps the entry. Kept entries move
  // down in place, in their order.
  const std::vector<PPropInfo>& Other = List.FList;
  size_t Kept = 0;
  size_t J = 0;
  for (PPropInfo P : FList) {
    if (J < Other.size() && Other[J] == P) { // the same record: lists of like classes
      FList[Kept++] = P;
      ++J;
      continue;
    }
    while (J < Other.size() && CompareText(Other[J]->Name, P->Name) < 0) ++J;
    for (size_t K = J; K < Other.size() && CompareText(Other[K]->Name, P->Name) == 0; ++K)
      if (Other[K]->PropType() == P->PropType()) {
        FList[Kept++] = P;
        J = K + 1;
        break;
      }
  }
  FList.resize(Kept);
}

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

namespace detail {

void RequireEditorClass(TClass Class, TClass Base, const char* Kind) {
  if (!Class || !Class->InheritsFrom(Base))
    throw EInvalidCast(sNotAnEditorClass, Class ? Class->ClassName : String("(none)"), Kind);
}

void StartEditorRegistries() {
  RegisterPropertyEditorProc = &RegisterPropertyEditorEntry;
  RegisterPropertyMapperProc = &RegisterPropertyMapperEntry;
  RegisterComponentEditorProc = &RegisterComponentEditorEntry;
  RegisterSelectionEditorProc = &RegisterSelectionEditorEntry;
  SetPropertyEditorGroupProc = &SetPropertyEditorGroupEntry;
  GetComponentPropertiesProc = &EnumerateComponentProperties;
  TRootHooks::GetComponentEditor = &GetComponentEditor;
  TRootHooks::SelectionEditorUnits = [](TComponentRoot& Root, TComponent* Component, const TGetStrProc& Proc) {
    IPtr<ISelectionEditorList> Editors = GetSelectionEditors(Root.AsDesigner(), Component);
    for (int I = 0; Editors && I < Editors->GetCount(); ++I) Editors->Get(I)->RequiresUnits(Proc);
  };
  StartComponentGuidelines();
}

void StopEditorRegistries() noexcept {
  RegisterPropertyEditorProc = nullptr;
  RegisterPropertyMapperProc = nullptr;
  RegisterComponentEditorProc = nullptr;
  RegisterSelectionEditorProc = nullptr;
  SetPropertyEditorGroupProc = nullptr;
  GetComponentPropertiesProc = nullptr;
  TRootHooks::GetComponentEditor = nullptr;
  TRootHooks::SelectionEditorUnits = nullptr;
  StopComponentGuidelines();
  TRegistryLists& L = Lists();
  L.PropertyClasses.clear();
  L.PropertyMappers.clear();
  L.ComponentClasses.clear();
  L.SelectionEditors.clear();
  L.EditorGroups.clear();
}

void RegisterDefaultEditors() {
  // The library's own registrations never belong to a package's group.
  int SavedGroup = CurrentGroup;
  auto RestoreGroup = Finally([&]() noexcept { CurrentGroup = SavedGroup; });
  CurrentGroup = -1;
  RegisterPropertyEditor(TComponent::StaticClass()->TypeInfo(), nullptr, "", TComponentProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TComponentName(), TComponent::StaticClass(), "Name",
                         TComponentNameProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TDateTime(), nullptr, "", TDateTimeProperty::StaticClass());
  RegisterPropertyEditor(InterfaceTypeInfo<IInterface>(), nullptr, "", TInterfaceProperty::StaticClass());
  RegisterPropertyEditor(TCollection::StaticClass()->TypeInfo(), nullptr, "", TCollectionProperty::StaticClass());
  RegisterSelectionEditor(TPersistent::StaticClass(), TEditActionSelectionEditor::StaticClass());
}

} // namespace detail

void InitializeDesignEditors() {
  static bool Joined = false;
  if (Joined) return;
  Joined = true;
  AddDesignCoreStep(TCoreStage::Registries, "PropertyEditors", &detail::StartEditorRegistries,
                    &detail::StopEditorRegistries);
  AddDesignCoreStep(TCoreStage::DefaultRegistrations, "DefaultPropertyEditors", &detail::RegisterDefaultEditors,
                    nullptr);
  InitializePropertyCategories();
}

} // namespace formkit
