//===- editors/EditorRegistry.h - Where design packages register editors -===//
//
// The lists behind the registration calls of the design contract
// (`RegisterPropertyEditor`, `RegisterPropertyMapper`, `RegisterComponentEditor`,
// `RegisterSelectionEditor`), each record stamped with the group of the package
// that made it; the group operations with which a host unloads a package; the
// choice of the editor class of one property; and the enumeration that turns a
// selection into the editors an inspector shows.
//
// Example (a host loading and unloading a design package):
//   int Group = NewEditorGroup();            // registrations now carry Group
//   RegisterPropertyEditor(TypeInfo<TColor>(), nullptr, "", TMyColorProperty::StaticClass());
//   ...
//   FreeEditorGroup(Group);                  // the earlier registrations are in force again
//
// The lists are not sorted: their order is part of the behaviour. Everything here
// runs on the host's user-interface thread.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

#include <deque>
#include <memory>

namespace formkit {

//===----------------------------------------------------------------------===//
// Records
//===----------------------------------------------------------------------===//

/// One registration of a property editor.
struct TPropertyClassRec {
  /// The group in force at registration.
  int Group = -1;
  /// The type the registration serves; identity of the type record.
  PTypeInfo PropertyType = nullptr;
  /// Empty means any name; kept only when `ComponentClass` is given.
  String PropertyName;
  /// Null means any class.
  TClass ComponentClass = nullptr;
  /// Null means any class group; set only by `SetPropertyEditorGroup`.
  TClass ClassGroup = nullptr;
  /// Null is legal and hides the property.
  TPropertyEditorClass EditorClass = nullptr;
};

/// One registered mapper.
struct TPropertyMapperRec {
  int Group = -1;
  TPropertyMapperFunc Mapper;
};

/// One registration of a component editor.
struct TComponentClassRec {
  int Group = -1;
  TClass ComponentClass = nullptr;
  TComponentEditorClass EditorClass = nullptr;
};

/// One registration of a selection editor; stamps the current group when made.
class FK_API TSelectionEditorDefinition : public TObject {
  FK_CLASS(TSelectionEditorDefinition, TObject)
  TSelectionEditorDefinition() = default;
  TSelectionEditorDefinition(TClass AClass, TSelectionEditorClass AEditor);
  /// True when `AClass` is the registered class or descends from it.
  bool Matches(TClass AClass) const;
  int Group() const noexcept { return FGroup; }
  TSelectionEditorClass Editor() const noexcept { return FEditor; }

private:
  int FGroup = -1;
  TClass FClass = nullptr;
  TSelectionEditorClass FEditor = nullptr;
};

//===----------------------------------------------------------------------===//
// The lists, read-only, for the parts that choose from them
//===----------------------------------------------------------------------===//

/// Newest first. Empty before the first registration.
FK_API const std::deque<TPropertyClassRec>& PropertyClassList();
/// Newest first.
FK_API const std::deque<TPropertyMapperRec>& PropertyMapperList();
/// Newest first.
FK_API const std::deque<TComponentClassRec>& ComponentClassList();
/// Oldest first; owns the definitions.
FK_API const std::vector<std::unique_ptr<TSelectionEditorDefinition>>& SelectionEditorDefinitions();

//===----------------------------------------------------------------------===//
// Groups
//===----------------------------------------------------------------------===//

/// Takes the lowest free group number as `CurrentGroup` and returns it. A number is
/// given out again once `FreeEditorGroup` has released it.
FK_API int NewEditorGroup();
/// Drops every registration of `Group` (property editors, component editors, mappers,
/// selection editors, guidelines, in that order), so that what they hid is in force
/// again; tells the group-change subscribers, last to first; releases the number. A
/// number never given out removes nothing and releases nothing.
FK_API void FreeEditorGroup(int Group);

//===----------------------------------------------------------------------===//
// Choosing editors
//===----------------------------------------------------------------------===//

/// The editor class of property `PropInfo` of `Obj`: the first mapper with an opinion;
/// else the most specific registration (which may hide the property with null); else the
/// default editor of the type kind, null for kinds that are not shown. Complexity: one
/// pass over the mappers and the registrations.
FK_API TPropertyEditorClass GetEditorClass(PPropInfo PropInfo, TPersistent* Obj);

/// The default editor class of each type kind; null for a kind that is not shown.
FK_API TPropertyEditorClass DefaultEditorClassOf(TTypeKind Kind);

/// The published properties of one object's class, of the given kinds, sorted by name
/// without regard to case. Holds plain references to immortal property records.
class FK_API TPropInfoList : public TObject {
  FK_CLASS(TPropInfoList, TObject)
  TPropInfoList() = default;
  TPropInfoList(TPersistent* Instance, TTypeKinds Filter);

  /// True when an entry has the same type record and the same name (without regard to case).
  bool Contains(PPropInfo P) const;
  /// Removes entry `Index`, closing the gap.
  void Delete(int Index);
  /// Keeps only the entries `List` contains, in their order. Complexity: O(n + m), one
  /// merge of the two name orders.
  void Intersect(const TPropInfoList& List);
  PPropInfo Items(int Index) const { return FList[static_cast<size_t>(Index)]; }
  int Count() const noexcept { return static_cast<int>(FList.size()); }

private:
  std::vector<PPropInfo> FList;
};

/// A new editor as the library drives it: the base for setting its pairs, the interface
/// for everything after `Initialize`. Both references hold the same object.
struct TNewPropertyEditor {
  IPtr<TBasePropertyEditor> Editor;
  IPtr<IProperty> Prop;
};

/// Makes an editor of `EditorClass` for `Designer` with room for `PropCount` pairs, through
/// its virtual constructor. Raises `EIntfCastError` "Interface not supported" when the
/// class does not serve `IProperty`.
[[nodiscard]] FK_API TNewPropertyEditor NewPropertyEditor(TPropertyEditorClass EditorClass,
                                                          const IPtr<IDesigner>& Designer, int PropCount);

//===----------------------------------------------------------------------===//
// Start and stop
//===----------------------------------------------------------------------===//

/// Joins the editor registries to the start of the design core: their registration hooks
/// with the registries, their built-in registrations with the default registrations.
/// Call once before `StartDesignCore`; a repeat does nothing.
FK_API void InitializeDesignEditors();

/// The message of a registered class that is not of the kind of editor it was registered as.
FK_RESOURCESTRING(sNotAnEditorClass, "Class %s is not a %s class");

namespace detail {
/// Raises `EInvalidCast` "Class %s is not a %s class" (naming the class, "(none)" for null,
/// and `Kind`) unless `Class` is `Base` or descends from it: a registration is trusted
/// with any class, and making an instance of the wrong one would corrupt memory.
FK_API void RequireEditorClass(TClass Class, TClass Base, const char* Kind);
/// Sets the registration hooks and the enumeration hook of the design contract.
FK_API void StartEditorRegistries();
/// Clears the hooks and frees every list: registrations then do nothing.
FK_API void StopEditorRegistries() noexcept;
/// The registrations the library makes itself, in group -1, before any package.
FK_API void RegisterDefaultEditors();
/// The enumeration behind `GetComponentProperties` of the design contract.
FK_API void EnumerateComponentProperties(const IPtr<IDesignerSelections>& Selections, TTypeKinds Kinds,
                                         const IPtr<IDesigner>& Designer, const TGetPropProc& Proc,
                                         const TPropertyEditorFilterFunc& Filter);
} // namespace detail

} // namespace formkit
