//===- editors/PropertyEnumeration.cpp - The inspector's view of a selection ===//
//
// Turns a selection of one or many objects into the editors of the properties they
// share. The candidates are cut down on the first object before the property lists
// of the others are built, and objects of the first object's class are not asked for
// an editor class again, so a selection of many like objects costs one lookup per
// property.
//
//===----------------------------------------------------------------------===//
#include "editors/EditorRegistry.h"
#include "editors/SelectionEditors.h"

#include <unordered_map>

namespace formkit {

namespace {

/// The selection filters chosen by the designer's current selection, and the properties
/// they are to filter.
struct TSelectionFilters {
  std::vector<IPtr<ISelectionPropertyFilter>> Filters;
  IPtr<IInterfaceList> Held;
};

TSelectionFilters GetSelectionFilters(const IPtr<IDesigner>& Designer) {
  TSelectionFilters Result;
  if (!Designer) return Result;
  IPtr<IDesignerSelections> Current = CreateSelectionList();
  Designer->GetSelections(Current);
  IPtr<ISelectionEditorList> Editors = GetSelectionEditors(Designer, Current);
  for (int I = 0; I < Editors->GetCount(); ++I)
    if (IPtr<ISelectionPropertyFilter> Filter = QueryAs<ISelectionPropertyFilter>(Editors->Get(I)))
      Result.Filters.push_back(Filter);
  if (!Result.Filters.empty()) Result.Held = NewAs<IInterfaceList, TInterfaceList>();
  return Result;
}

/// Whether a trial editor on the first object alone rules the property out, by the tests
/// of the enumeration in their order.
bool TrialRejects(TPersistent* First, PPropInfo Prop, TPropertyEditorClass EditorClass, int SelectionCount,
                  const IPtr<IDesigner>& Designer, const TPropertyEditorFilterFunc& Filter) {
  TNewPropertyEditor Trial = NewPropertyEditor(EditorClass, Designer, 1);
  Trial.Editor->SetPropEntry(0, First, Prop);
  Trial.Editor->Initialize();
  if (!Prop->IsReadable()) return true;
  // A read-only object property stays, so that its nested properties can be reached.
  if (!GShowReadOnlyProps && Prop->Kind() != tkClass && !Prop->IsWritable()) return true;
  if (SelectionCount > 1 && !Trial.Prop->GetAttributes().Contains(paMultiSelect)) return true;
  if (!Trial.Prop->ValueAvailable()) return true;
  return Filter && !Filter(Trial.Prop);
}

/// The properties of the first object that may be shown: sorted by name, cut down by a
/// trial editor each, from the last to the first.
std::unique_ptr<TPropInfoList> FindCandidates(TPersistent* First, TTypeKinds Kinds, int SelectionCount,
                                              const IPtr<IDesigner>& Designer,
                                              const TPropertyEditorFilterFunc& Filter) {
  auto Candidates = std::make_unique<TPropInfoList>(First, Kinds);
  for (int I = Candidates->Count() - 1; I >= 0; --I) {
    PPropInfo Prop = Candidates->Items(I);
    TPropertyEditorClass EditorClass = GetEditorClass(Prop, First);
    if (!EditorClass || TrialRejects(First, Prop, EditorClass, SelectionCount, Designer, Filter))
      Candidates->Delete(I);
  }
  return Candidates;
}

/// The selected objects, read once, with the property list of each. Objects of one class
/// have the same list, so one list serves them all: it is built and intersected once.
struct TSelectedObjects {
  std::vector<TPersistent*> Objects;
  std::vector<bool> OfFirstClass;
  /// The list of each object, in selection order: a back reference into `ClassLists`.
  std::vector<TPropInfoList*> Lists;
  /// One list for each class, in the order the classes first appear.
  std::vector<std::pair<TClass, std::unique_ptr<TPropInfoList>>> ClassLists;

  TSelectedObjects(const IPtr<IDesignerSelections>& Selections, TTypeKinds Kinds) {
    const auto Count = static_cast<size_t>(Selections->GetCount());
    Objects.reserve(Count);
    OfFirstClass.reserve(Count);
    Lists.reserve(Count);
    for (size_t J = 0; J < Count; ++J) {
      Objects.push_back(Selections->Get(static_cast<int>(J)));
      TClass Class = Objects.back()->ClassType();
      OfFirstClass.push_back(Class == Objects.front()->ClassType());
      Lists.push_back(ListOfClass(Class, Objects.back(), Kinds));
    }
  }

private:
  TPropInfoList* ListOfClass(TClass Class, TPersistent* Obj, TTypeKinds Kinds) {
    auto [Where, Added] = IndexOfClass.try_emplace(Class, ClassLists.size());
    if (Added) ClassLists.emplace_back(Class, std::make_unique<TPropInfoList>(Obj, Kinds));
    return ClassLists[Where->second].second.get();
  }
  std::unordered_map<TClass, size_t> IndexOfClass;
};

/// The editor of candidate `Index` over every selected object, or null when an object of
/// another class than the first would have another editor class.
IPtr<IProperty> EditorForAll(const TSelectedObjects& Selected, int Index, TPropertyEditorClass EditorClass,
                             const IPtr<IDesigner>& Designer) {
  const int Count = static_cast<int>(Selected.Objects.size());
  TNewPropertyEditor New = NewPropertyEditor(EditorClass, Designer, Count);
  for (int J = 0; J < Count; ++J) {
    TPersistent* Obj = Selected.Objects[static_cast<size_t>(J)];
    PPropInfo Prop = Selected.Lists[static_cast<size_t>(J)]->Items(Index);
    if (!Selected.OfFirstClass[static_cast<size_t>(J)] && GetEditorClass(Prop, Obj) != EditorClass) return nullptr;
    New.Editor->SetPropEntry(J, Obj, Prop);
  }
  New.Editor->Initialize();
  return New.Prop;
}

} // namespace

namespace detail {

void EnumerateComponentProperties(const IPtr<IDesignerSelections>& Selections, TTypeKinds Kinds,
                                  const IPtr<IDesigner>& Designer, const TGetPropProc& Proc,
                                  const TPropertyEditorFilterFunc& Filter) {
  if (!Selections) return;
  const int Count = Selections->GetCount();
  if (Count == 0) return;
  TSelectionFilters Filters = GetSelectionFilters(Designer);
  TPersistent* First = Selections->Get(0);
  std::unique_ptr<TPropInfoList> Candidates = FindCandidates(First, Kinds, Count, Designer, Filter);

  // Every list ends with the same properties in the same name order, so one index
  // addresses the same property in each.
  TSelectedObjects Selected(Selections, Kinds);
  for (const auto& Entry : Selected.ClassLists) Candidates->Intersect(*Entry.second);
  for (const auto& Entry : Selected.ClassLists) Entry.second->Intersect(*Candidates);

  for (int I = 0; I < Candidates->Count(); ++I) {
    TPropertyEditorClass EditorClass = GetEditorClass(Candidates->Items(I), First);
    if (!EditorClass) continue;
    IPtr<IProperty> Editor = EditorForAll(Selected, I, EditorClass, Designer);
    if (!Editor || !Editor->ValueAvailable()) continue;
    if (Filters.Held) Filters.Held->Add(Editor);
    else Proc(Editor);
  }
  if (!Filters.Held) return;
  for (const IPtr<ISelectionPropertyFilter>& F : Filters.Filters) F->FilterProperties(Selections, Filters.Held);
  for (int I = 0; I < Filters.Held->GetCount(); ++I) Proc(CastAs<IProperty>(Filters.Held->Get(I)));
}

} // namespace detail

} // namespace formkit
