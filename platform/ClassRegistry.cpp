//===- platform/ClassRegistry.cpp - Class registry, groups, root lookup ---===//
#include "platform/Classes.h"

#include <algorithm>
#include <map>

namespace formkit {

FK_RESOURCESTRING(SClassNotFound, "Class %s not found");
FK_RESOURCESTRING(SDuplicateClass, "A class named %s already exists");

namespace {

struct ClassGroup {
  TClass Representative;
  /// Roots of the class trees that belong to the group.
  std::vector<TClass> Members;
  /// Registered classes by upper-cased name.
  std::map<String, TClass> Classes;
};

struct Registry {
  std::vector<ClassGroup> Groups; // index 0 is the base group of TPersistent
  size_t Active = 0;
  Registry() { Groups.push_back({TPersistent::StaticClass(), {TPersistent::StaticClass()}, {}}); }
};

Registry& TheRegistry() {
  static Registry* R = new Registry; // immortal: classes are looked up during teardown
  return *R;
}

/// The group whose member is the nearest ancestor of `Class`; the base group otherwise.
size_t GroupIndexOf(const Registry& R, TClass Class) {
  size_t Best = 0;
  int BestDepth = -1;
  for (size_t G = 0; G < R.Groups.size(); ++G)
    for (TClass Member : R.Groups[G].Members) {
      int Depth = 0;
      for (TClass C = Member; C; C = C->Parent) ++Depth;
      // The deepest matching member wins; a later group wins a tie.
      if (Class->InheritsFrom(Member) && Depth >= BestDepth) {
        Best = G;
        BestDepth = Depth;
      }
    }
  return Best;
}

TClass Compiled(TClass Class) { return Class->Compiled ? Class->Compiled : Class; }

} // namespace

void RegisterClass(TClass Class) {
  Registry& R = TheRegistry();
  auto& Classes = R.Groups[GroupIndexOf(R, Compiled(Class))].Classes;
  String Key = UpperCase(Class->ClassName);
  auto It = Classes.find(Key);
  if (It != Classes.end()) {
    if (It->second == Class) return;
    throw EComponentError(SDuplicateClass, Class->ClassName);
  }
  Classes.emplace(Key, Class);
}

void RegisterClasses(std::initializer_list<TClass> Classes) {
  for (TClass C : Classes) RegisterClass(C);
}

void UnRegisterClass(TClass Class) {
  for (ClassGroup& G : TheRegistry().Groups) {
    auto It = G.Classes.find(UpperCase(Class->ClassName));
    if (It != G.Classes.end() && It->second == Class) G.Classes.erase(It);
  }
}

TClass GetClass(std::string_view ClassName) {
  Registry& R = TheRegistry();
  String Key = UpperCase(ClassName);
  for (size_t G : {R.Active, size_t(0)}) {
    auto It = R.Groups[G].Classes.find(Key);
    if (It != R.Groups[G].Classes.end()) return It->second;
  }
  return nullptr;
}

FK_IMPLEMENT(TClassFinder, "Classes") {}

TClass TClassFinder::GetClass(std::string_view ClassName) const {
  Registry& R = TheRegistry();
  String Key = UpperCase(ClassName);
  std::vector<size_t> Groups{FClass ? GroupIndexOf(R, Compiled(FClass)) : size_t(0)};
  if (FIncludeActiveGroups) Groups.push_back(R.Active);
  Groups.push_back(0);
  for (size_t G : Groups) {
    auto It = R.Groups[G].Classes.find(Key);
    if (It != R.Groups[G].Classes.end()) return It->second;
  }
  return nullptr;
}

TClass FindClass(std::string_view ClassName) {
  TClass C = GetClass(ClassName);
  if (!C) throw EClassNotFound(SClassNotFound, String(ClassName));
  return C;
}

void StartClassGroup(TClass Group) {
  Registry& R = TheRegistry();
  for (ClassGroup& G : R.Groups)
    if (G.Representative == Group) return;
  R.Groups.push_back({Group, {Group}, {}});
}

void GroupDescendentsWith(TClass Class, TClass GroupClass) {
  Registry& R = TheRegistry();
  size_t G = GroupIndexOf(R, Compiled(GroupClass));
  auto& Members = R.Groups[G].Members;
  if (std::find(Members.begin(), Members.end(), Class) == Members.end()) Members.push_back(Class);
}

TClass ClassGroupOf(TClass Class) {
  Registry& R = TheRegistry();
  return R.Groups[GroupIndexOf(R, Compiled(Class))].Representative;
}

TClass ClassGroupOf(const TObject* Instance) { return ClassGroupOf(Instance->ClassType()); }

TClass ActivateClassGroup(TClass Class) {
  Registry& R = TheRegistry();
  TClass Previous = R.Groups[R.Active].Representative;
  R.Active = GroupIndexOf(R, Compiled(Class));
  return Previous;
}

int CurrentGroup = -1;

TClass CurrentClassGroup() {
  Registry& R = TheRegistry();
  return R.Groups[R.Active].Representative;
}

std::function<void(const std::vector<TClass>&)> RegisterNoIconProc;

void RegisterNoIcon(const std::vector<TClass>& Classes) {
  if (RegisterNoIconProc) RegisterNoIconProc(Classes);
}

IPtr<IDesignerNotify> FindRootDesigner(TPersistent* Obj) {
  TPersistent* Top = Obj;
  while (Top) {
    TPersistent* Up = Top->GetOwner();
    if (!Up) break;
    Top = Up;
  }
  auto* Root = dynamic_cast<TComponent*>(Top);
  return Root ? Root->GetDesigner() : nullptr;
}

TComponent* FindNestedComponent(TComponent* Root, std::string_view Path) {
  TComponent* Current = Root;
  while (Current && !Path.empty()) {
    size_t Dot = Path.find('.');
    std::string_view Step = Path.substr(0, Dot);
    Current = Current->FindComponent(Step);
    Path = Dot == std::string_view::npos ? std::string_view() : Path.substr(Dot + 1);
  }
  return Current == Root ? nullptr : Current;
}

} // namespace formkit
