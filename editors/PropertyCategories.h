//===- editors/PropertyCategories.h - Properties grouped by category ------===//
//
// The inspector groups properties by category and can hide whole categories. A
// category is a named list of filters, newest first; a filter takes properties
// by a wildcard mask on the name, by component class and by property type. A
// property may stand in several categories, and in "Miscellaneous" when in
// none. Packages register filters through `RegisterPropertyInCategory` and lose
// them with their group. The host runs a pass over the properties between
// `ClearMatches` calls, shows what `Match` lets through, and keeps the hidden
// names through two procedures it sets.
//
// Example:
//   RegisterPropertyInCategory(sLayoutCategoryName, TControl::StaticClass(), "Left");
//   TPropertyCategoryList* List = PropertyCategoryList();
//   List->ClearMatches();
//   bool Shown = List->Match("Left", TButton::StaticClass(), nullptr);
//   List->ChangeVisibility(pcvNotListed, {"Layout"});   // hides the other categories
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntfClasses.h"
#include "platform/Masks.h"

#include <functional>
#include <memory>
#include <vector>

namespace formkit {

class TPropertyEditor;

FK_ENUM(TPropertyCategoryVisibleMode, std::uint8_t, pcvAll, pcvToggle, pcvNone, pcvNotListed, pcvOnlyListed)

//===----------------------------------------------------------------------===//
// Filters
//===----------------------------------------------------------------------===//

/// Takes properties by name alone.
class FK_API TPropertyFilter : public TObject {
  FK_CLASS(TPropertyFilter, TObject)
  TPropertyFilter() = default;
  /// No mask for an empty `AFilter`: every name matches.
  TPropertyFilter(const String& AFilter, int AGroup);

  /// Whether `APropertyName` matches the mask; the object and the editor are not looked at.
  virtual bool Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject,
                     const IPtr<IProperty>& AProperty);
  int Group() const noexcept { return FGroup; }

protected:
  bool NameMatches(const String& Name) const { return !FMask || FMask->Matches(Name); }

private:
  std::unique_ptr<TMask> FMask;
  int FGroup = -1;
};

/// Takes properties by name, component class and property type; what is not given
/// matches any.
class FK_API TComponentPropertyFilter : public TPropertyFilter {
  FK_CLASS(TComponentPropertyFilter, TPropertyFilter)
  TComponentPropertyFilter() = default;
  TComponentPropertyFilter(const String& APropertyName, TClass AComponentClass, PTypeInfo APropertyType, int AGroup);

  /// The class must be or inherit from the filter's; the type must be the filter's, or
  /// both classes with the property's inheriting from the filter's; the mask must match.
  bool Match(const String& APropertyName, TClass AComponentClass, PTypeInfo APropertyType) const;
  /// The name (or the editor's), the object's class and the property's type, through the
  /// other form; false for an object that is no persistent.
  bool Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject,
             const IPtr<IProperty>& AProperty) override;

  TClass ComponentClass() const noexcept { return FComponentClass; }
  PTypeInfo PropertyType() const noexcept { return FPropertyType; }

private:
  TClass FComponentClass = nullptr;
  PTypeInfo FPropertyType = nullptr;
};

//===----------------------------------------------------------------------===//
// Categories
//===----------------------------------------------------------------------===//

/// A named list of filters, newest first. Owns its filters.
class FK_API TPropertyCategory : public TObject {
  FK_CLASS(TPropertyCategory, TObject)
  TPropertyCategory() = default;
  TPropertyCategory(const String& AName, int AGroup) : FGroup(AGroup), FName(AName) {}

  /// Takes `AFilter` in first; gives it back.
  TPropertyFilter* Add(std::unique_ptr<TPropertyFilter> AFilter);
  /// Frees `AFilter` if it is one of these.
  void Remove(TPropertyFilter* AFilter);
  int Count() const noexcept { return static_cast<int>(FList.size()); }
  TPropertyFilter* Filters(int Index) const;

  /// Whether a class-and-type filter takes the property; without a type, the class's
  /// published property of that name gives it. Counts a match.
  bool Match(const String& APropertyName, TClass AComponentClass, PTypeInfo APropertyType);
  /// Whether any filter takes the property of `DesignObject`. Counts a match.
  bool Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject, const IPtr<IProperty>& AProperty);
  void ClearMatches() noexcept { FMatchCount = 0; }
  /// Frees the filters of `AGroup`.
  void FreeEditorGroup(int AGroup);

  int MatchCount() const noexcept { return FMatchCount; }
  bool Visible() const noexcept { return FVisible; }
  void SetVisible(bool Value) noexcept { FVisible = Value; }
  bool Enabled() const noexcept { return FEnabled; }
  void SetEnabled(bool Value) noexcept { FEnabled = Value; }
  /// For the host's use; not owned, not set here.
  TPropertyEditor* Editor() const noexcept { return FEditor; }
  void SetEditor(TPropertyEditor* Value) noexcept { FEditor = Value; }
  int Group() const noexcept { return FGroup; }
  const String& Name() const noexcept { return FName; }

private:
  std::vector<std::unique_ptr<TPropertyFilter>> FList;
  int FMatchCount = 0;
  TPropertyEditor* FEditor = nullptr;
  bool FEnabled = true;
  int FGroup = -1;
  String FName;
  bool FVisible = true;
};

/// Every category, newest first, with the miscellaneous one that takes what no other
/// takes. Owns its categories.
class FK_API TPropertyCategoryList : public TObject {
  FK_CLASS(TPropertyCategoryList, TObject)

  /// The category of that name (letter case counts); a new one, first in the list and
  /// visible unless its name is among the hidden, when there is none.
  TPropertyCategory* FindCategory(const String& ACategoryName);
  /// The index of that category, or -1.
  int IndexOf(const String& ACategoryName) const;
  void ClearMatches() noexcept;
  /// Frees, from the last to the first and leaving the miscellaneous one alone, each
  /// category the group first named, and the group's filters in the others.
  void FreeEditorGroup(int AGroup);
  /// "Miscellaneous", made on first use.
  TPropertyCategory* MiscCategory();
  int Count() const noexcept { return static_cast<int>(FList.size()); }
  TPropertyCategory* Categories(int Index) const;

  /// Whether the property is to be shown: a visible category takes it, or none takes it
  /// and the miscellaneous one is visible.
  bool Match(const String& APropertyName, TClass AComponentClass, PTypeInfo APropertyType);
  bool Match(const String& APropertyName, const IPtr<IDesignObject>& DesignObject, const IPtr<IProperty>& AProperty);

  /// Shows or hides the categories by `AMode`; a category that matched nothing in the
  /// last pass keeps its state. True when any changed.
  bool ChangeVisibility(TPropertyCategoryVisibleMode AMode);
  bool ChangeVisibility(TPropertyCategoryVisibleMode AMode, const std::vector<String>& ANames);
  /// Takes the hidden names from the host, when it gives them, and shows the others.
  void LoadHiddenCategories();
  /// Hands the names of the hidden categories, in list order, to the host.
  void SaveHiddenCategories();
  /// The hidden names, as last loaded or saved.
  const TStringList& HiddenCategories() const noexcept { return FHiddenCategories; }

private:
  template <class MatchFn> bool MatchAll(MatchFn&& InCategory);
  std::vector<std::unique_ptr<TPropertyCategory>> FList;
  TPropertyCategory* FMiscCategory = nullptr; // owned by FList
  TStringList FHiddenCategories;
};

/// Set by the host: the comma text of the hidden category names.
FK_API extern std::function<String()> GetHiddenCategoriesProc;
/// Set by the host before it saves: keeps the comma text of the hidden names.
FK_API extern std::function<void(const String&)> SetHiddenCategoriesProc;

/// The one list, made at the first call with the miscellaneous category taking every
/// property in both forms, and the hidden names loaded.
FK_API TPropertyCategoryList* PropertyCategoryList();

/// Whether `ACategoryName` takes the property of `AClass`; an unknown category is made,
/// and answers false.
FK_API bool IsPropertyInCategory(const String& ACategoryName, TClass AClass, const String& APropertyName);
/// The same for a registered class name; raises `EClassNotFound` for an unknown one.
FK_API bool IsPropertyInCategory(const String& ACategoryName, const String& AClassName, const String& APropertyName);

/// Joins the design core: registrations land in the list from its start, the list goes
/// with a package's group, and it is freed when the core stops.
FK_API void InitializePropertyCategories();

} // namespace formkit
