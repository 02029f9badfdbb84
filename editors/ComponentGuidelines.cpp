//===- editors/ComponentGuidelines.cpp - Guides of components and their registry ---===//
#include "editors/ComponentGuidelines.h"

#include "editors/EditorRegistry.h"
#include "surface/Designer.h"

#include <array>
#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

namespace formkit {

// Every kind lies on exactly one axis, and the kinds are the contiguous range up to the
// baseline: a kind past it is one the enumeration does not have.
static_assert((HorzGuideTypes + VertGuideTypes).Mask() == 0x1FFF &&
              (HorzGuideTypes.Mask() & VertGuideTypes.Mask()) == 0);

//===----------------------------------------------------------------------===//
// TComponentGuidelines
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TComponentGuidelines, "DesignEditors") {}

void TComponentGuidelines::Initialize(TComponent* AComponent, TComponent* AContainer) {
  FComponent = AComponent;
  FContainer = AContainer;
}

int TComponentGuidelines::InternalGetDesignerGuideOffset(int Index) {
  const int Offset = GetGuideOffset(Index);
  const TDesignerGuideType Type = GetDesignerGuideType(Index);
  if (static_cast<unsigned>(Type) > static_cast<unsigned>(gtBaseline)) return NoGuideOffset;
  // A horizontal line stands at a Y position.
  return IsHorzGuide(Type) ? CalcVertPos(Offset) : CalcHorzPos(Offset);
}

//===----------------------------------------------------------------------===//
// The registry
//===----------------------------------------------------------------------===//

namespace {

/// One registration: a guidelines class for a component class, with the group in force
/// when it was made. The records of one component class form a chain, newest first.
struct TComponentGuidelineRec {
  TComponentGuidelineRec* Next = nullptr;
  TClass ComponentClass = nullptr;
  TClass ComponentGuidelinesClass = nullptr;
  int Group = 0;
};

/// The head of each component class's chain, found by the identity of the class in 256
/// buckets. Owns every record of every chain.
class TGuidelineBucketList {
public:
  static constexpr std::size_t BucketCount = 256;

  TGuidelineBucketList() = default;
  TGuidelineBucketList(const TGuidelineBucketList&) = delete;
  TGuidelineBucketList& operator=(const TGuidelineBucketList&) = delete;
  ~TGuidelineBucketList() { Clear(); }

  /// The head of the chain of `Class`; null when the class has none.
  TComponentGuidelineRec* GetData(TClass Class) const noexcept {
    const TEntry* E = Find(Class);
    return E ? E->Head : nullptr;
  }
  /// Enters `Class`, which has no chain yet, with `Head` as its chain; adopts `Head` once
  /// this returns.
  void Add(TClass Class, TComponentGuidelineRec* Head) { BucketOf(Class).push_back({Class, Head}); }
  /// Makes `Head` the head of the chain of `Class`, which has one.
  void SetData(TClass Class, TComponentGuidelineRec* Head) noexcept { Find(Class)->Head = Head; }
  /// Takes `Class` out; its chain must be empty by now.
  void Remove(TClass Class) noexcept {
    TBucket& B = BucketOf(Class);
    TEntry* E = Find(Class);
    *E = B.back(); // the order within a bucket means nothing
    B.pop_back();
  }
  /// Calls `Fn` with every record of every chain.
  template <class Fn> void ForEachRecord(Fn&& F) const {
    for (const TBucket& B : FBuckets)
      for (const TEntry& E : B)
        for (TComponentGuidelineRec* R = E.Head; R; R = R->Next) F(R);
  }
  /// Frees every record.
  void Clear() noexcept {
    for (TBucket& B : FBuckets) {
      for (const TEntry& E : B)
        for (TComponentGuidelineRec* R = E.Head; R;) delete std::exchange(R, R->Next);
      B.clear();
    }
  }

private:
  struct TEntry {
    TClass Class;
    TComponentGuidelineRec* Head;
  };
  using TBucket = std::vector<TEntry>;

  static std::size_t Hash(TClass Class) noexcept {
    // Records are aligned, so the lowest bits say nothing; fold in higher ones.
    const auto Bits = reinterpret_cast<std::uintptr_t>(Class);
    return ((Bits >> 4) ^ (Bits >> 12)) % BucketCount;
  }
  TBucket& BucketOf(TClass Class) noexcept { return FBuckets[Hash(Class)]; }
  const TBucket& BucketOf(TClass Class) const noexcept { return FBuckets[Hash(Class)]; }
  TEntry* Find(TClass Class) noexcept {
    return const_cast<TEntry*>(static_cast<const TGuidelineBucketList*>(this)->Find(Class));
  }
  const TEntry* Find(TClass Class) const noexcept {
    for (const TEntry& E : BucketOf(Class))
      if (E.Class == Class) return &E;
    return nullptr;
  }

  std::array<TBucket, BucketCount> FBuckets;
};

/// The registrations; null until the first one, and again after a stop.
std::unique_ptr<TGuidelineBucketList>& ComponentGuidelinesList() {
  static std::unique_ptr<TGuidelineBucketList> List;
  return List;
}

void RegisterGuidelines(TClass ComponentClass, TClass GuidelinesClass) {
  std::unique_ptr<TGuidelineBucketList>& List = ComponentGuidelinesList();
  TComponentGuidelineRec* Head = List ? List->GetData(ComponentClass) : nullptr;
  // Registering the class in force again changes nothing; one further down the chain
  // comes to the head again.
  if (Head && Head->ComponentGuidelinesClass == GuidelinesClass) return;
  auto Rec = std::make_unique<TComponentGuidelineRec>(
      TComponentGuidelineRec{Head, ComponentClass, GuidelinesClass, CurrentGroup});
  if (!List) List = std::make_unique<TGuidelineBucketList>();
  if (Head) List->SetData(ComponentClass, Rec.get());
  else List->Add(ComponentClass, Rec.get());
  static_cast<void>(Rec.release()); // the list holds it now
}

/// The guidelines class registered for `Class` or its nearest ancestor below
/// `TPersistent`; `TComponentGuidelines` when none has one.
TClass RegisteredGuidelinesClass(TClass Class) {
  if (const std::unique_ptr<TGuidelineBucketList>& List = ComponentGuidelinesList())
    for (TClass C = Class; C && C != TPersistent::StaticClass(); C = C->Parent)
      if (const TComponentGuidelineRec* Head = List->GetData(C)) return Head->ComponentGuidelinesClass;
  return TComponentGuidelines::StaticClass();
}

/// Takes `Rec` out of its chain, and its class out of the list if it was the last.
void Unlink(TGuidelineBucketList& List, TComponentGuidelineRec* Rec) noexcept {
  TComponentGuidelineRec* Head = List.GetData(Rec->ComponentClass);
  if (Head == Rec) {
    if (Rec->Next) List.SetData(Rec->ComponentClass, Rec->Next);
    else List.Remove(Rec->ComponentClass);
    return;
  }
  TComponentGuidelineRec* Before = Head;
  while (Before->Next != Rec) Before = Before->Next;
  Before->Next = Rec->Next;
}

} // namespace

IPtr<IComponentGuidelines> GuidelinesFor(const IPtr<IDesigner>& Designer, TComponent* AComponent,
                                         TComponent* AContainer) {
  if (!AComponent) throw EArgumentException(sGuidelinesWithoutComponent);
  const TClass Class = RegisteredGuidelinesClass(AComponent->ClassType());
  detail::RequireEditorClass(Class, TBaseComponentGuidelines::StaticClass(), "component guidelines");
  // The one reference is held from the construction on: when `Initialize` raises, the
  // instance goes with it on the way out and the exception passes on.
  IPtr<TBaseComponentGuidelines> Guidelines = NewFromClass<TBaseComponentGuidelines>(Class, Designer);
  Guidelines->Initialize(AComponent, AContainer);
  return CastAs<IComponentGuidelines>(Guidelines);
}

void StartComponentGuidelines() { RegisterComponentGuidelinesProc = &RegisterGuidelines; }

void StopComponentGuidelines() noexcept {
  RegisterComponentGuidelinesProc = nullptr;
  ComponentGuidelinesList().reset();
}

void FreeComponentGuidelinesGroup(int Group) {
  std::unique_ptr<TGuidelineBucketList>& List = ComponentGuidelinesList();
  if (!List) return;
  // All records of the group first, then the unlinking, which changes the chains walked.
  std::vector<TComponentGuidelineRec*> Doomed;
  List->ForEachRecord([&](TComponentGuidelineRec* Rec) {
    if (Rec->Group == Group) Doomed.push_back(Rec);
  });
  for (TComponentGuidelineRec* Rec : Doomed) {
    Unlink(*List, Rec);
    delete Rec;
  }
}

} // namespace formkit
