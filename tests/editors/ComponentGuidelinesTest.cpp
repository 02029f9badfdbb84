//===- tests/editors/ComponentGuidelinesTest.cpp - Guidelines and their registry ===//
//
// The registry of guidelines classes on sample component classes: which class
// serves a component, how registrations stack per class and go with their group,
// how an instance is made and what happens when that fails, and how the offsets
// of the base class reach their axis.
//
//===----------------------------------------------------------------------===//
#include "editors/ComponentGuidelines.h"

#include "tests/fakes/FakeRoot.h"

#include <gtest/gtest.h>

#include <utility>
#include <vector>

using namespace formkit;

namespace {

// Sample components: a chain of three classes below `TComponent`.
class TSampleBase : public TComponent {
  FK_CLASS(TSampleBase, TComponent)
};
class TSampleMiddle : public TSampleBase {
  FK_CLASS(TSampleMiddle, TSampleBase)
};
class TSampleLeaf : public TSampleMiddle {
  FK_CLASS(TSampleLeaf, TSampleMiddle)
};

/// Counts the live instances of the class it is a member of in `Count`.
struct TLiveCount {
  int& Count;
  explicit TLiveCount(int& C) : Count(C) { ++Count; }
  ~TLiveCount() { --Count; }
  TLiveCount(const TLiveCount&) = delete;
  TLiveCount& operator=(const TLiveCount&) = delete;
};

/// Counts its live instances and keeps what it was made and initialised with.
class TProbeGuides : public TComponentGuidelines {
  FK_CLASS(TProbeGuides, TComponentGuidelines)
  static inline int Alive = 0;
  TLiveCount Counted{Alive};
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }
};
// Three distinct classes to tell registrations apart.
class TGuidesA : public TProbeGuides {
  FK_CLASS(TGuidesA, TProbeGuides)
};
class TGuidesB : public TProbeGuides {
  FK_CLASS(TGuidesB, TProbeGuides)
};
class TGuidesC : public TProbeGuides {
  FK_CLASS(TGuidesC, TProbeGuides)
};

/// Refuses every component.
class TRefusingGuides : public TProbeGuides {
  FK_CLASS(TRefusingGuides, TProbeGuides)
  void Initialize(TComponent* AComponent, TComponent* AContainer) override {
    inherited::Initialize(AComponent, AContainer);
    throw EInvalidOperation("No guides for %s", AComponent->ClassName());
  }
};

/// A guidelines class that forgot the interface.
class TMuteGuides : public TBaseComponentGuidelines {
  FK_CLASS(TMuteGuides, TBaseComponentGuidelines)
  static inline int Alive = 0;
  TLiveCount Counted{Alive};
  void Initialize(TComponent*, TComponent*) override {}
};

/// Guides from a table, with positions that tell which conversion they went through.
class TTableGuides : public TComponentGuidelines {
  FK_CLASS(TTableGuides, TComponentGuidelines)
  std::vector<std::pair<TDesignerGuideType, int>> Table;
  int CalcHorzPos(int APos) override { return APos + 1000; }
  int CalcVertPos(int APos) override { return APos + 2000; }
  int GetCount() override { return static_cast<int>(Table.size()); }
  TDesignerGuideType GetDesignerGuideType(int Index) override { return Table.at(Index).first; }
  int GetGuideOffset(int Index) override { return Table.at(Index).second; }
};

} // namespace

FK_IMPLEMENT(TSampleBase, "Tests") {}
FK_IMPLEMENT(TSampleMiddle, "Tests") {}
FK_IMPLEMENT(TSampleLeaf, "Tests") {}
FK_IMPLEMENT(TProbeGuides, "Tests") {}
FK_IMPLEMENT(TGuidesA, "Tests") {}
FK_IMPLEMENT(TGuidesB, "Tests") {}
FK_IMPLEMENT(TGuidesC, "Tests") {}
FK_IMPLEMENT(TRefusingGuides, "Tests") {}
FK_IMPLEMENT(TMuteGuides, "Tests") {}
FK_IMPLEMENT(TTableGuides, "Tests") {}

namespace {

struct ComponentGuidelinesTest : ::testing::Test {
  TObjectGuard<TComponent> Base{CreateComponentOf<TSampleBase>(nullptr)};
  TObjectGuard<TComponent> Middle{CreateComponentOf<TSampleMiddle>(nullptr)};
  TObjectGuard<TComponent> Leaf{CreateComponentOf<TSampleLeaf>(nullptr)};
  TObjectGuard<TComponent> Plain{CreateComponentOf<TComponent>(nullptr)};

  void SetUp() override { StartComponentGuidelines(); }
  void TearDown() override {
    StopComponentGuidelines();
    CurrentGroup = -1;
  }

  /// The class of the guidelines that serve `Component`.
  static TClass Served(TComponent* Component) {
    IPtr<IComponentGuidelines> G = GuidelinesFor(nullptr, Component, nullptr);
    return dynamic_cast<TObject*>(G.Get())->ClassType();
  }
  /// Registers under `Group`.
  static void RegisterIn(int Group, TClass ComponentClass, TClass GuidelinesClass) {
    CurrentGroup = Group;
    RegisterComponentGuidelines(ComponentClass, GuidelinesClass);
  }
};

TEST_F(ComponentGuidelinesTest, AComponentIsServedByItsOwnClassOrItsNearestRegisteredAncestor) {
  // Nothing registered: the base class, which offers no guides.
  EXPECT_EQ(Served(Leaf.Get()), TComponentGuidelines::StaticClass());
  EXPECT_EQ(GuidelinesFor(nullptr, Leaf.Get(), nullptr)->GetCount(), 0);

  RegisterComponentGuidelines(TSampleBase::StaticClass(), TGuidesA::StaticClass());
  EXPECT_EQ(Served(Base.Get()), TGuidesA::StaticClass());
  EXPECT_EQ(Served(Leaf.Get()), TGuidesA::StaticClass()); // two ancestors up
  EXPECT_EQ(Served(Plain.Get()), TComponentGuidelines::StaticClass());

  RegisterComponentGuidelines(TSampleMiddle::StaticClass(), TGuidesB::StaticClass());
  EXPECT_EQ(Served(Leaf.Get()), TGuidesB::StaticClass()); // the nearer ancestor wins
  EXPECT_EQ(Served(Middle.Get()), TGuidesB::StaticClass());
  EXPECT_EQ(Served(Base.Get()), TGuidesA::StaticClass());
}

TEST_F(ComponentGuidelinesTest, TheWalkUpStopsBelowTPersistent) {
  RegisterComponentGuidelines(TPersistent::StaticClass(), TGuidesA::StaticClass());
  RegisterComponentGuidelines(TObject::StaticClass(), TGuidesB::StaticClass());
  EXPECT_EQ(Served(Plain.Get()), TComponentGuidelines::StaticClass());
  EXPECT_EQ(Served(Leaf.Get()), TComponentGuidelines::StaticClass());
  RegisterComponentGuidelines(TComponent::StaticClass(), TGuidesC::StaticClass());
  EXPECT_EQ(Served(Plain.Get()), TGuidesC::StaticClass());
  EXPECT_EQ(Served(Leaf.Get()), TGuidesC::StaticClass());
}

TEST_F(ComponentGuidelinesTest, WithoutTheRegistryRunningRegistrationsAreLost) {
  StopComponentGuidelines();
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TGuidesA::StaticClass());
  StartComponentGuidelines();
  EXPECT_EQ(Served(Base.Get()), TComponentGuidelines::StaticClass());

  // A stop forgets what was registered while it ran.
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TGuidesA::StaticClass());
  StopComponentGuidelines();
  EXPECT_EQ(Served(Base.Get()), TComponentGuidelines::StaticClass());
  StartComponentGuidelines();
  EXPECT_EQ(Served(Base.Get()), TComponentGuidelines::StaticClass());
}

TEST_F(ComponentGuidelinesTest, TheNewestRegistrationLeadsAndARepeatOfTheLeaderIsIgnored) {
  const TClass X = TSampleBase::StaticClass();
  RegisterIn(1, X, TGuidesA::StaticClass());
  RegisterIn(2, X, TGuidesB::StaticClass());
  EXPECT_EQ(Served(Base.Get()), TGuidesB::StaticClass());
  // A class further down the chain is registered anew and leads again.
  RegisterIn(3, X, TGuidesA::StaticClass());
  EXPECT_EQ(Served(Base.Get()), TGuidesA::StaticClass());
  // A repeat of the leader is not recorded: releasing group 3 uncovers group 2's class,
  // where a recorded repeat of group 4 would still lead.
  RegisterIn(4, X, TGuidesA::StaticClass());
  FreeComponentGuidelinesGroup(3);
  EXPECT_EQ(Served(Base.Get()), TGuidesB::StaticClass());
  FreeComponentGuidelinesGroup(4); // nothing of group 4 was kept
  EXPECT_EQ(Served(Base.Get()), TGuidesB::StaticClass());
  FreeComponentGuidelinesGroup(2);
  EXPECT_EQ(Served(Base.Get()), TGuidesA::StaticClass());
  FreeComponentGuidelinesGroup(1);
  EXPECT_EQ(Served(Base.Get()), TComponentGuidelines::StaticClass());
}

TEST_F(ComponentGuidelinesTest, AGroupGoesFromTheHeadsAndFromInsideTheChains) {
  const TClass X = TSampleMiddle::StaticClass();
  // The chain of X, newest first: A (group 1), B (group 2), C (group 1).
  RegisterIn(1, X, TGuidesC::StaticClass());
  RegisterIn(2, X, TGuidesB::StaticClass());
  RegisterIn(1, X, TGuidesA::StaticClass());
  // Group 1 alone serves the ancestor, which loses its only record.
  RegisterIn(1, TSampleBase::StaticClass(), TGuidesC::StaticClass());
  EXPECT_EQ(Served(Leaf.Get()), TGuidesA::StaticClass());

  FreeComponentGuidelinesGroup(1);
  EXPECT_EQ(Served(Leaf.Get()), TGuidesB::StaticClass());
  EXPECT_EQ(Served(Base.Get()), TComponentGuidelines::StaticClass());
  FreeComponentGuidelinesGroup(2); // C went with group 1, so nothing is left for X
  EXPECT_EQ(Served(Leaf.Get()), TComponentGuidelines::StaticClass());
  EXPECT_EQ(Served(Middle.Get()), TComponentGuidelines::StaticClass());
}

TEST_F(ComponentGuidelinesTest, ARecordTakenFromInsideAChainLeavesTheRestLinked) {
  const TClass X = TSampleBase::StaticClass();
  // Newest first: A (group 2), B (group 1), C (group 3).
  RegisterIn(3, X, TGuidesC::StaticClass());
  RegisterIn(1, X, TGuidesB::StaticClass());
  RegisterIn(2, X, TGuidesA::StaticClass());
  FreeComponentGuidelinesGroup(1);
  EXPECT_EQ(Served(Base.Get()), TGuidesA::StaticClass());
  FreeComponentGuidelinesGroup(2);
  EXPECT_EQ(Served(Base.Get()), TGuidesC::StaticClass());
  // A group that registered nothing, or was never given out, changes nothing.
  FreeComponentGuidelinesGroup(7);
  FreeComponentGuidelinesGroup(-5);
  EXPECT_EQ(Served(Base.Get()), TGuidesC::StaticClass());
}

TEST_F(ComponentGuidelinesTest, ManyClassesKeepTheirOwnChains) {
  // Every class keeps its own chain, and a release that empties some chains leaves the
  // others alone, whichever buckets they share.
  const TClass Classes[] = {TObject::StaticClass(),     TPersistent::StaticClass(),   TComponent::StaticClass(),
                            TSampleBase::StaticClass(), TSampleMiddle::StaticClass(), TSampleLeaf::StaticClass(),
                            TGuidesA::StaticClass(),    TGuidesB::StaticClass(),      TGuidesC::StaticClass()};
  int Group = 0;
  for (TClass C : Classes) RegisterIn(Group++ % 2, C, TGuidesA::StaticClass());
  RegisterIn(1, TSampleLeaf::StaticClass(), TGuidesB::StaticClass());
  FreeComponentGuidelinesGroup(0); // TObject, TComponent, TSampleMiddle, ...
  EXPECT_EQ(Served(Leaf.Get()), TGuidesB::StaticClass());
  EXPECT_EQ(Served(Middle.Get()), TGuidesA::StaticClass()); // from TSampleBase, group 1
  EXPECT_EQ(Served(Plain.Get()), TComponentGuidelines::StaticClass());
  FreeComponentGuidelinesGroup(1);
  EXPECT_EQ(Served(Leaf.Get()), TComponentGuidelines::StaticClass());
}

TEST_F(ComponentGuidelinesTest, AnInstanceIsMadeForTheDesignerAndBoundToItsComponent) {
  IPtr<fakes::TFakeRoot> Root = New<fakes::TFakeRoot>("Form1", nullptr);
  IPtr<IDesigner> Designer = InterfaceOf<IDesigner>(Root.Get());
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TGuidesA::StaticClass());
  {
    IPtr<IComponentGuidelines> G = GuidelinesFor(Designer, Leaf.Get(), Base.Get());
    auto* Guides = dynamic_cast<TGuidesA*>(G.Get());
    ASSERT_NE(Guides, nullptr);
    EXPECT_EQ(Guides->Designer(), Designer);
    EXPECT_EQ(Guides->Component(), Leaf.Get());
    EXPECT_EQ(Guides->Container(), Base.Get());
    EXPECT_EQ(TProbeGuides::Alive, 1);
  }
  EXPECT_EQ(TProbeGuides::Alive, 0); // the guides die with the last reference
}

TEST_F(ComponentGuidelinesTest, AFailedInitializationFreesTheInstanceAndPassesTheError) {
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TRefusingGuides::StaticClass());
  try {
    static_cast<void>(GuidelinesFor(nullptr, Middle.Get(), nullptr));
    FAIL() << "the refusal passes on";
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "No guides for TSampleMiddle");
  }
  EXPECT_EQ(TProbeGuides::Alive, 0);
  // The registry is unchanged by the failure.
  RegisterComponentGuidelines(TSampleMiddle::StaticClass(), TGuidesA::StaticClass());
  EXPECT_EQ(Served(Middle.Get()), TGuidesA::StaticClass());
  EXPECT_THROW(static_cast<void>(GuidelinesFor(nullptr, Base.Get(), nullptr)), EInvalidOperation);
}

TEST_F(ComponentGuidelinesTest, WhatCannotServeAsGuidelinesIsRefusedClearly) {
  auto MessageOf = [&](TComponent* Component) {
    try {
      static_cast<void>(GuidelinesFor(nullptr, Component, nullptr));
    } catch (const Exception& E) {
      return String(E.ClassName()) + ": " + E.Message();
    }
    return String("no error");
  };
  EXPECT_EQ(MessageOf(nullptr), "EArgumentException: Guidelines need a component");

  // Registration itself takes anything, nil included.
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TSampleLeaf::StaticClass());
  EXPECT_EQ(MessageOf(Base.Get()), "EInvalidCast: Class TSampleLeaf is not a component guidelines class");
  RegisterComponentGuidelines(TSampleBase::StaticClass(), nullptr);
  EXPECT_EQ(MessageOf(Base.Get()), "EInvalidCast: Class (none) is not a component guidelines class");
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TBaseComponentGuidelines::StaticClass());
  EXPECT_EQ(MessageOf(Base.Get()),
            "EInvalidOperation: Cannot create an instance of abstract class TBaseComponentGuidelines");
  RegisterComponentGuidelines(TSampleBase::StaticClass(), TMuteGuides::StaticClass());
  EXPECT_EQ(MessageOf(Base.Get()), "EIntfCastError: Interface not supported");
  EXPECT_EQ(TMuteGuides::Alive, 0);

  // A nil component class is a key like any other and serves nobody.
  RegisterComponentGuidelines(nullptr, TGuidesA::StaticClass());
  EXPECT_EQ(Served(Plain.Get()), TComponentGuidelines::StaticClass());
}

TEST_F(ComponentGuidelinesTest, TheBaseClassOffersNothingAndOffsetsKeepToTheirAxis) {
  IPtr<IComponentGuidelines> Base = GuidelinesFor(nullptr, Plain.Get(), nullptr);
  EXPECT_EQ(Base->GetCount(), 0);
  EXPECT_EQ(Base->GetDesignerGuideType(0), gtAlignLeft);
  EXPECT_EQ(Base->GetDesignerGuideOffset(0), 2147483647);

  IPtr<TTableGuides> Table = New<TTableGuides>();
  Table->Initialize(Plain.Get(), nullptr);
  // On the X axis through CalcHorzPos (+1000), on the Y axis through CalcVertPos (+2000).
  Table->Table = {{gtAlignLeft, 1},   {gtAlignTop, 2},     {gtAlignRight, 3},   {gtAlignBottom, 4},
                  {gtMarginLeft, 5},  {gtMarginTop, 6},    {gtMarginRight, 7},  {gtMarginBottom, 8},
                  {gtPaddingLeft, 9}, {gtPaddingTop, 10},  {gtPaddingRight, 11}, {gtPaddingBottom, 12},
                  {gtBaseline, 13},   {static_cast<TDesignerGuideType>(13), 14},
                  {static_cast<TDesignerGuideType>(255), 15}};
  IPtr<IComponentGuidelines> G = InterfaceOf<IComponentGuidelines>(Table.Get());
  std::vector<int> Offsets;
  for (int I = 0; I < G->GetCount(); ++I) Offsets.push_back(G->GetDesignerGuideOffset(I));
  EXPECT_EQ(Offsets, (std::vector<int>{1001, 2002, 1003, 2004, 1005, 2006, 1007, 2008, 1009, 2010, 1011, 2012,
                                       2013, 2147483647, 2147483647}));
  EXPECT_EQ(G->GetDesignerGuideType(12), gtBaseline);
}

} // namespace
