//===- tests/surface/SelectionsTest.cpp - Items and selection lists ------===//
#include "tests/surface/SurfaceFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// Counts notifications and remembers the count the list had at each.
class TSelListener : public TInterfacedObject, public ISelectionsListener {
  FK_CLASS(TSelListener, TInterfacedObject)
  FK_INTERFACES(ISelectionsListener)
  void SelectionChanged(const IPtr<ISelections>& S) override { Counts.push_back(S->GetCount()); }
  std::vector<int> Counts;
};
FK_IMPLEMENT(TSelListener, "Tests") {}

/// An item that is not a persistent item at all.
class TBareItem : public TPersistentItem {
  FK_CLASS(TBareItem, TPersistentItem)
  void* GetInterfaceEntry(const TGUID& IID) override {
    if (IID == IPersistentItem::IID) return nullptr;
    return inherited::GetInterfaceEntry(IID);
  }
  bool Equals(const IPtr<IItem>&) override {
    ++EqualsCalls;
    return false;
  }
  static inline int EqualsCalls = 0;
};
FK_IMPLEMENT(TBareItem, "Tests") {}

/// A persistent item that only says where it is.
class TPlain : public TPersistentItem {
  FK_CLASS(TPlain, TPersistentItem)
  using TPersistentItem::TPersistentItem;
  TRect GetBoundsRect() override { return TRect{10, 20, 30, 50}; }
};
FK_IMPLEMENT(TPlain, "Tests") {}

class SelectionsTest : public ::testing::Test {
protected:
  void SetUp() override {
    S = New<TTestSurface>();
    A = S->AddControl(nullptr, "A", Bounds(10, 20, 20, 30));
    B = S->AddControl(nullptr, "B", Bounds(50, 20, 20, 30));
    C = S->AddControl(nullptr, "C", Bounds(90, 20, 20, 30));
    Sel = NewAs<ISelections, TSimpleSelections>();
    L = New<TSelListener>();
    Sel->AddListener(IPtr<ISelectionsListener>(L));
  }
  std::vector<String> Names() {
    std::vector<String> R;
    for (int I = 0; I < Sel->GetCount(); ++I) R.push_back(TTestSurface::NameOf(Sel->GetItems(I)));
    return R;
  }
  IPtr<TTestSurface> S;
  TTestControl *A, *B, *C;
  IPtr<ISelections> Sel;
  IPtr<TSelListener> L;
};

} // namespace

TEST_F(SelectionsTest, ItemsAreMadeFreshAndComparedByWhatTheyStandFor) {
  IPtr<IItem> A1 = S->ItemOf(A), A2 = S->ItemOf(A);
  EXPECT_NE(A1.Get(), A2.Get());
  EXPECT_TRUE(SameItem(A1, A2));
  EXPECT_FALSE(SameItem(A1, S->ItemOf(B)));
  EXPECT_TRUE(SameItem(nullptr, nullptr));
  IPtr<TBareItem> BareObj = New<TBareItem>();
  IPtr<IItem> Bare(static_cast<IItem*>(static_cast<IItemEx*>(BareObj.Get())));
  TBareItem::EqualsCalls = 0;
  EXPECT_FALSE(SameItem(Bare, nullptr));
  EXPECT_FALSE(SameItem(nullptr, Bare));
  EXPECT_TRUE(SameItem(Bare, Bare)); // the same reference needs no call
  EXPECT_EQ(TBareItem::EqualsCalls, 0);
  EXPECT_FALSE(A1->Equals(Bare)); // no persistent behind it
  EXPECT_EQ(ExtractPersistent(Bare), nullptr);
  EXPECT_EQ(ExtractComponent(A1), A);
  EXPECT_EQ(ExtractComponent(nullptr), nullptr);
}

TEST_F(SelectionsTest, PersistentItemDefaults) {
  IPtr<TPlain> P = New<TPlain>(A);
  IPtr<IItem> I(static_cast<IItem*>(static_cast<IItemEx*>(P.Get())));
  EXPECT_EQ(I->GetClientRect(), (TRect{0, 0, 20, 30}));
  EXPECT_EQ(I->GetExtendedRect(), (TRect{10, 20, 30, 50}));
  EXPECT_FALSE(I->Contains(S->ItemOf(B)));
  EXPECT_FALSE(I->IsContainer());
  EXPECT_EQ(I->GetParent(), nullptr);
  EXPECT_FALSE(Supports<IItemEx>(I)); // optional abilities are a descendant's choice
  EXPECT_TRUE(Supports<IPersistentItem>(I));
  EXPECT_TRUE(I->Equals(S->ItemOf(A)));
  try {
    I->ValidateDeletable();
    FAIL() << "no exception";
  } catch (const Exception& E) {
    EXPECT_STREQ(E.ClassName(), "Exception");
    EXPECT_EQ(E.Message(), "Cannot delete a persistent reference from the designer");
  }
}

TEST_F(SelectionsTest, AddKeepsOnePlacePerItemAndNotifiesOnlyOnChange) {
  Sel->Add(S->ItemOf(A));
  Sel->Add(S->ItemOf(A)); // another object for the same control
  Sel->Add(S->ItemOf(B));
  EXPECT_EQ(Names(), (std::vector<String>{"A", "B"}));
  EXPECT_EQ(L->Counts, (std::vector<int>{1, 2}));
  EXPECT_TRUE(Sel->Selected(S->ItemOf(B)));
  EXPECT_FALSE(Sel->Selected(S->ItemOf(C)));
  Sel->Remove(S->ItemOf(C)); // absent: nothing, no notification
  EXPECT_EQ(L->Counts.size(), 2u);
}

/// An item of another kind that says it is the same as every item.
class TWildcardItem : public TBareItem {
  FK_CLASS(TWildcardItem, TBareItem)
  bool Equals(const IPtr<IItem>&) override { return true; }
};
FK_IMPLEMENT(TWildcardItem, "Tests") {}

TEST_F(SelectionsTest, AnItemOfAnotherKindIsStillAskedWhetherItIsTheSame) {
  // Only persistent items at first: found by what they stand for, wherever they are.
  Sel->Add(S->ItemOf(A));
  Sel->Add(S->ItemOf(B));
  Sel->Add(S->ItemOf(C));
  auto* List = static_cast<TSimpleSelections*>(QueryAs<ISelections>(Sel).Get());
  EXPECT_EQ(List->IndexOf(S->ItemOf(C)), 2);
  Sel->Remove(0);
  EXPECT_EQ(List->IndexOf(S->ItemOf(A)), -1);
  EXPECT_EQ(List->IndexOf(S->ItemOf(C)), 1);
  // An item of another kind in the list answers for itself: it claims every item.
  IPtr<TWildcardItem> Wild = New<TWildcardItem>();
  Sel->Add(IPtr<IItem>(static_cast<IItem*>(static_cast<IItemEx*>(Wild.Get()))));
  EXPECT_EQ(List->IndexOf(S->ItemOf(A)), 2);
  Sel->Add(S->ItemOf(A)); // taken for the wildcard: not added again
  EXPECT_EQ(Sel->GetCount(), 3);
  Sel->Remove(2);
  EXPECT_EQ(List->IndexOf(S->ItemOf(A)), -1);
  Sel->Clear();
  EXPECT_EQ(List->IndexOf(S->ItemOf(B)), -1);
}

TEST_F(SelectionsTest, BatchesNotifyOnceAtTheOuterEnd) {
  Sel->BeginSelections();
  Sel->BeginSelections();
  EXPECT_EQ(Sel->GetSelectionLevel(), 2);
  Sel->Add(S->ItemOf(A));
  Sel->Add(S->ItemOf(B));
  Sel->EndSelections();
  EXPECT_EQ(Sel->GetSelectionLevel(), 1);
  EXPECT_TRUE(L->Counts.empty());
  Sel->EndSelections();
  EXPECT_EQ(Sel->GetSelectionLevel(), 0);
  EXPECT_EQ(L->Counts, (std::vector<int>{2}));

  // A batch that touches and restores still notifies once; one that touches nothing, never.
  L->Counts.clear();
  Sel->BeginSelections();
  Sel->Add(S->ItemOf(C));
  Sel->Remove(S->ItemOf(C));
  Sel->EndSelections();
  EXPECT_EQ(L->Counts, (std::vector<int>{2}));
  Sel->BeginSelections();
  Sel->EndSelections();
  EXPECT_EQ(L->Counts.size(), 1u);
  EXPECT_THROW(Sel->EndSelections(), EInvalidOperation);
}

TEST_F(SelectionsTest, ClearNotifiesEvenWhenEmpty) {
  Sel->Clear();
  EXPECT_EQ(L->Counts, (std::vector<int>{0}));
  EXPECT_EQ(Sel->GetItems(0), nullptr);
}

TEST_F(SelectionsTest, AnchorIsTheFirstAndRemovingItPromotesTheNext) {
  Sel->Add(S->ItemOf(A));
  Sel->Add(S->ItemOf(B));
  Sel->Add(S->ItemOf(C));
  Sel->Remove(S->ItemOf(A));
  EXPECT_EQ(Names(), (std::vector<String>{"B", "C"}));
  Sel->Toggle(S->ItemOf(A)); // back, at the end: not the anchor again
  EXPECT_EQ(Names(), (std::vector<String>{"B", "C", "A"}));
  Sel->Toggle(S->ItemOf(C));
  Sel->Remove(0);
  EXPECT_EQ(Names(), (std::vector<String>{"A"}));
  EXPECT_THROW(Sel->Remove(3), EListError);
  EXPECT_THROW(Sel->GetItems(-1), EListError);
  EXPECT_EQ(Names(), (std::vector<String>{"A"}));
}

TEST_F(SelectionsTest, RemovedListenerHearsNothing) {
  Sel->RemoveListener(IPtr<ISelectionsListener>(L));
  Sel->Add(S->ItemOf(A));
  EXPECT_TRUE(L->Counts.empty());
}

TEST_F(SelectionsTest, SelectInEngineTogglesAndPlacesHandles) {
  IPtr<TDesigner> D = New<TDesigner>(IPtr<IDesignSurface>(S), Sel, nullptr);
  S->Log.Clear();
  D->Select(S->ItemOf(A), false);
  D->Select(S->ItemOf(B), true);
  D->Select(S->ItemOf(A), true); // toggled out; one left
  EXPECT_EQ(Names(), (std::vector<String>{"B"}));
  EXPECT_EQ(L->Counts, (std::vector<int>{1, 2, 1})); // one notification per call
  // The handles go on the item passed, as the surface asked for it.
  EXPECT_EQ(S->Log.Calls, (std::vector<String>{"AttachHandles(A)", "AttachHandles(nil)", "AttachHandles(A)"}));
  D->Select(nullptr, false);
  EXPECT_EQ(Names(), (std::vector<String>{"B"}));
  D->Close();
  EXPECT_EQ(S->Listener, nullptr);
}
