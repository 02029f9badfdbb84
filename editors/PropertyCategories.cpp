//===- editors/PropertyCategories.cpp - Properties grouped by category ----===//
#include "editors/PropertyCategories.h"

#include "core/DesignCore.h"
#include "core/EditorGroups.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TPropertyFilter, "PropertyCategories") {}
FK_IMPLEMENT(TComponentPropertyFilter, "PropertyCategories") {}
FK_IMPLEMENT(TPropertyCategory, "PropertyCategories") {}
FK_IMPLEMENT(TPropertyCategoryList, "PropertyCategories") {}

std::function<String()> GetHiddenCategoriesProc;
std::function<void(const String&)> SetHiddenCategoriesProc;

namespace {
/// The one list; made at the first request, freed when the design core stops.
TPropertyCategoryList* TheList = nullptr;

/// The type of the published property `Name` of `Class`, or null.
PTypeInfo PublishedType(TClass Class, const String& Name) {
  PPropInfo Prop = Class ? Class->FindProperty(Name) : nullptr;
  return Prop ? Prop->PropType() : nullptr;
}

bool Listed(const std::vector<String>& Names, const String& Name) {
  return std::find(Names.begin(), Names.end(), Name) != Names.end();
}
} // namespace

//===----------------------------------------------------------------------===//
// Filters
//===----------------------------------------------------------------------===//

TPropertyFilter::TPropertyFilter(const String& AFilter, int AGroup)
    : FMask(AFilter.empty() ? nullptr : std::make_unique<TMask>(AFilter)), FGroup(AGroup) {}

bool TPropertyFilter::Match(const String& APropertyName, const IPtr<IDesignObject>&, const IPtr<IProperty>&) {
  return NameMatches(APropertyName);
}

TComponentPropertyFilter::TComponentPropertyFilter(const String& APropertyName, TClass AComponentClass,
                                                   PTypeInfo APropertyType, int AGroup)
    : TPropertyFilter(APropertyName, AGroup), FComponentClass(AComponentClass), FPropertyType(APropertyType) {}

bool TComponentPropertyFilter::Match(const String& APropertyName, TClass AComponentClass,
                                     PTypeInfo APropertyType) const {
  if (FComponentClass && (!AComponentClass || !AComponentClass->InheritsFrom(FComponentClass))) return false;
  if (FPropertyType) {
    if (!APropertyType) return false;
    bool Same = APropertyType == FPropertyType;
    bool Descends = APropertyType->Kind == tkClass && FPropertyType->Kind == tkClass &&
                    GetTypeData(APropertyType)->ClassRef->InheritsFrom(GetTypeData(FPropertyType)->ClassRef);
    if (!Same && !Descends) return false;
  }
  return NameMatches(APropertyName);
}

bool TComponentPropertyFilter::Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject,
                                     const IPtr<IProperty>& AProperty) {
  String Name = APropertyName.empty() && AProperty ? AProperty->GetName() : APropertyName;
  IPtr<IDesignPersistent> Persistent = QueryAs<IDesignPersistent>(DesignObject);
  TPersistent* Object = Persistent ? Persistent->GetPersistent() : nullptr;
  if (!Object) return false;
  PTypeInfo Type = AProperty ? AProperty->GetPropType() : PublishedType(Object->ClassType(), Name);
  return Match(Name, Object->ClassType(), Type);
}

//===----------------------------------------------------------------------===//
// TPropertyCategory
//===----------------------------------------------------------------------===//

TPropertyFilter* TPropertyCategory::Add(std::unique_ptr<TPropertyFilter> AFilter) {
  FList.insert(FList.begin(), std::move(AFilter));
  return FList.front().get();
}

void TPropertyCategory::Remove(TPropertyFilter* AFilter) {
  std::erase_if(FList, [&](const std::unique_ptr<TPropertyFilter>& F) { return F.get() == AFilter; });
}

TPropertyFilter* TPropertyCategory::Filters(int Index) const {
  if (Index < 0 || Index >= Count()) throw EListError(SListIndexError, Index);
  return FList[static_cast<std::size_t>(Index)].get();
}

bool TPropertyCategory::Match(const String& APropertyName, TClass AComponentClass, PTypeInfo APropertyType) {
  if (!APropertyType && AComponentClass) APropertyType = PublishedType(AComponentClass, APropertyName);
  bool Matched = std::any_of(FList.begin(), FList.end(), [&](const std::unique_ptr<TPropertyFilter>& F) {
    auto* Typed = dynamic_cast<TComponentPropertyFilter*>(F.get());
    return Typed && Typed->Match(APropertyName, AComponentClass, APropertyType);
  });
  if (Matched) ++FMatchCount;
  return Matched;
}

bool TPropertyCategory::Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject,
                              const IPtr<IProperty>& AProperty) {
  bool Matched = std::any_of(FList.begin(), FList.end(), [&](const std::unique_ptr<TPropertyFilter>& F) {
    return F->Match(APropertyName, DesignObject, AProperty);
  });
  if (Matched) ++FMatchCount;
  return Matched;
}

void TPropertyCategory::FreeEditorGroup(int AGroup) {
  std::erase_if(FList, [&](const std::unique_ptr<TPropertyFilter>& F) { return F->Group() == AGroup; });
}

//===----------------------------------------------------------------------===//
// TPropertyCategoryList
//===----------------------------------------------------------------------===//

TPropertyCategory* TPropertyCategoryList::FindCategory(const String& ACategoryName) {
  if (int At = IndexOf(ACategoryName); At >= 0) return FList[static_cast<std::size_t>(At)].get();
  auto Category = std::make_unique<TPropertyCategory>(ACategoryName, CurrentGroup);
  Category->SetVisible(FHiddenCategories.IndexOf(ACategoryName) < 0);
  FList.insert(FList.begin(), std::move(Category));
  return FList.front().get();
}

int TPropertyCategoryList::IndexOf(const String& ACategoryName) const {
  for (std::size_t I = 0; I < FList.size(); ++I)
    if (FList[I]->Name() == ACategoryName) return static_cast<int>(I);
  return -1;
}

void TPropertyCategoryList::ClearMatches() noexcept {
  for (auto& Category : FList) Category->ClearMatches();
}

void TPropertyCategoryList::FreeEditorGroup(int AGroup) {
  for (int I = Count() - 1; I >= 0; --I) {
    TPropertyCategory* Category = FList[static_cast<std::size_t>(I)].get();
    if (Category == FMiscCategory) continue;
    if (Category->Group() == AGroup) FList.erase(FList.begin() + I);
    else Category->FreeEditorGroup(AGroup);
  }
}

TPropertyCategory* TPropertyCategoryList::MiscCategory() {
  if (!FMiscCategory) FMiscCategory = FindCategory(LoadResString(sMiscellaneousCategoryName));
  return FMiscCategory;
}

TPropertyCategory* TPropertyCategoryList::Categories(int Index) const {
  if (Index < 0 || Index >= Count()) throw EListError(SListIndexError, Index);
  return FList[static_cast<std::size_t>(Index)].get();
}

template <class MatchFn> bool TPropertyCategoryList::MatchAll(MatchFn&& InCategory) {
  TPropertyCategory* Misc = MiscCategory();
  bool SomeMatched = false;
  for (std::size_t I = 0; I < FList.size(); ++I) {
    TPropertyCategory* Category = FList[I].get();
    if (Category == Misc) continue;
    bool Matched = InCategory(*Category);
    SomeMatched = SomeMatched || Matched;
    if (Matched && Category->Visible()) return true;
  }
  if (SomeMatched) return false; // only in hidden categories
  return InCategory(*Misc) && Misc->Visible();
}

bool TPropertyCategoryList::Match(const String& APropertyName, TClass AComponentClass, PTypeInfo APropertyType) {
  if (!APropertyType && AComponentClass) APropertyType = PublishedType(AComponentClass, APropertyName);
  return MatchAll([&](TPropertyCategory& C) { return C.Match(APropertyName, AComponentClass, APropertyType); });
}

bool TPropertyCategoryList::Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject,
                                  const IPtr<IProperty>& AProperty) {
  return MatchAll([&](TPropertyCategory& C) { return C.Match(APropertyName, DesignObject, AProperty); });
}

bool TPropertyCategoryList::ChangeVisibility(TPropertyCategoryVisibleMode AMode) { return ChangeVisibility(AMode, {}); }

bool TPropertyCategoryList::ChangeVisibility(TPropertyCategoryVisibleMode AMode, const std::vector<String>& ANames) {
  bool Changed = false;
  for (auto& Category : FList) {
    bool Visible = Category->Visible();
    switch (AMode) {
    case pcvAll: Visible = true; break;
    case pcvToggle: Visible = !Visible; break;
    case pcvNone: Visible = false; break;
    case pcvNotListed: Visible = !Listed(ANames, Category->Name()); break;
    case pcvOnlyListed: Visible = Listed(ANames, Category->Name()); break;
    }
    if (Visible == Category->Visible() || Category->MatchCount() < 1) continue;
    Category->SetVisible(Visible);
    Changed = true;
  }
  return Changed;
}

void TPropertyCategoryList::LoadHiddenCategories() {
  if (GetHiddenCategoriesProc) FHiddenCategories.SetCommaText(GetHiddenCategoriesProc());
  for (auto& Category : FList) Category->SetVisible(FHiddenCategories.IndexOf(Category->Name()) < 0);
}

void TPropertyCategoryList::SaveHiddenCategories() {
  FHiddenCategories.Clear();
  for (auto& Category : FList)
    if (!Category->Visible()) FHiddenCategories.Add(Category->Name());
  SetHiddenCategoriesProc(FHiddenCategories.CommaText());
}

//===----------------------------------------------------------------------===//
// The one list
//===----------------------------------------------------------------------===//

TPropertyCategoryList* PropertyCategoryList() {
  if (TheList) return TheList;
  auto List = std::make_unique<TPropertyCategoryList>();
  TPropertyCategory* Misc = List->MiscCategory();
  Misc->Add(std::make_unique<TPropertyFilter>(String(), -1));
  Misc->Add(std::make_unique<TComponentPropertyFilter>(String(), nullptr, nullptr, -1));
  List->LoadHiddenCategories();
  TheList = List.release();
  return TheList;
}

bool IsPropertyInCategory(const String& ACategoryName, TClass AClass, const String& APropertyName) {
  return PropertyCategoryList()->FindCategory(ACategoryName)->Match(APropertyName, AClass, nullptr);
}

bool IsPropertyInCategory(const String& ACategoryName, const String& AClassName, const String& APropertyName) {
  return IsPropertyInCategory(ACategoryName, FindClass(AClassName), APropertyName);
}

namespace {
void RegisterInCategory(const String& CategoryName, TClass ComponentClass, PTypeInfo PropertyType,
                        const String& PropertyName) {
  PropertyCategoryList()->FindCategory(CategoryName)->Add(
      std::make_unique<TComponentPropertyFilter>(PropertyName, ComponentClass, PropertyType, CurrentGroup));
}

void CategoryGroupChanged(int Group) {
  if (TheList) TheList->FreeEditorGroup(Group);
}

void StartPropertyCategories() {
  RegisterPropertyInCategoryProc = &RegisterInCategory;
  NotifyGroupChange(&CategoryGroupChanged);
}

void StopPropertyCategories() noexcept {
  UnnotifyGroupChange(&CategoryGroupChanged);
  RegisterPropertyInCategoryProc = nullptr;
  delete std::exchange(TheList, nullptr);
}
} // namespace

void InitializePropertyCategories() {
  static bool Joined = false;
  if (Joined) return;
  Joined = true;
  AddDesignCoreStep(TCoreStage::Registries, "PropertyCategories", &StartPropertyCategories, &StopPropertyCategories);
}

} // namespace formkit
