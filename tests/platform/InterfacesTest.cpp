//===- tests/platform/InterfacesTest.cpp - Counted interfaces ------------===//
#include "platform/Lists.h"

#include <thread>

#include <gtest/gtest.h>

using namespace formkit;

namespace {

struct IGreeter60 : IInterface {
  FK_INTERFACE(IGreeter60, IInterface, "{11111111-2222-4333-8444-555555555560}")
  virtual String Hello() = 0;
};
struct IGreeter70 : IGreeter60 {
  FK_INTERFACE(IGreeter70, IGreeter60, "{11111111-2222-4333-8444-555555555570}")
  virtual String Goodbye() = 0;
};
struct IGreeter : IGreeter70 {
  FK_INTERFACE(IGreeter, IGreeter70, "{11111111-2222-4333-8444-555555555580}")
  virtual int Count() = 0;
};
struct ICounter : IInterface {
  FK_INTERFACE(ICounter, IInterface, "{AAAAAAAA-BBBB-4CCC-8DDD-EEEEEEEEEEEE}")
  virtual int Next() = 0;
};
struct IUnrelated : IInterface {
  FK_INTERFACE(IUnrelated, IInterface, "{0F0F0F0F-0F0F-4F0F-8F0F-0F0F0F0F0F0F}")
};

int Alive = 0;

class TGreeter : public TInterfacedObject, public IGreeter, public ICounter {
  FK_CLASS(TGreeter, TInterfacedObject)
  FK_INTERFACES(IGreeter, ICounter)
  TGreeter() { ++Alive; }
  void BeforeDestruction() override {
    --Alive;
    inherited::BeforeDestruction();
  }
  String Hello() override { return "hello"; }
  String Goodbye() override { return "goodbye"; }
  int Count() override { return 3; }
  int Next() override { return ++N; }
  int N = 0;
};
FK_IMPLEMENT(TGreeter, "Tests") {}

/// A listener list holding counted references, as a designer's notification list does.
std::vector<IPtr<ICounter>>& Listeners() {
  static std::vector<IPtr<ICounter>> L;
  return L;
}

/// Registers itself, then releases its own reference so the list does not keep it
/// alive; leaves the list as it dies.
class TSelfRegistering : public TInterfacedObject, public ICounter {
  FK_CLASS(TSelfRegistering, TInterfacedObject)
  FK_INTERFACES(ICounter)
  TSelfRegistering() {
    ++Alive;
    Listeners().push_back(IPtr<ICounter>(this));
    DropOwnReference();
  }
  void BeforeDestruction() override {
    --Alive;
    auto& L = Listeners();
    for (size_t I = L.size(); I-- > 0;)
      if (L[I].Get() == static_cast<ICounter*>(this)) {
        L[I].Detach(); // the registration holds no reference of its own
        L.erase(L.begin() + static_cast<std::ptrdiff_t>(I));
      }
    inherited::BeforeDestruction();
  }
  int Next() override { return 0; }
};
FK_IMPLEMENT(TSelfRegistering, "Tests") {}

} // namespace

TEST(Interfaces, IdentitiesAreParsedAndPrinted) {
  constexpr TGUID G = TGUID::Parse("{11111111-2222-4333-8444-555555555570}");
  EXPECT_EQ(G, IGreeter70::IID);
  EXPECT_EQ(G.ToString(), "{11111111-2222-4333-8444-555555555570}");
  EXPECT_EQ(TGUID::FromString("{aaaaaaaa-bbbb-4ccc-8ddd-eeeeeeeeeeee}"), ICounter::IID);
  EXPECT_THROW(TGUID::FromString("{not-a-guid}"), EConvertError);
  EXPECT_FALSE(IGreeter60::IID == IGreeter70::IID);
}

TEST(Interfaces, SupportsAnswersCountedOrNull) {
  {
    IPtr<TGreeter> Obj = New<TGreeter>();
    EXPECT_EQ(Obj->RefCount(), 1);
    EXPECT_TRUE(Supports<ICounter>(Obj.Get()));
    EXPECT_EQ(Obj->RefCount(), 1); // asking without an out-value does not count

    IPtr<ICounter> Counter;
    EXPECT_TRUE(Supports(Obj.Get(), Counter));
    EXPECT_EQ(Obj->RefCount(), 2);
    EXPECT_EQ(Counter->Next(), 1);

    IPtr<IUnrelated> None = QueryAs<IUnrelated>(Counter);
    EXPECT_EQ(None, nullptr);
    IPtr<IUnrelated> Out = QueryAs<IUnrelated>(Counter);
    EXPECT_FALSE(Supports(IPtr<ICounter>(Counter), Out));
    EXPECT_EQ(Out, nullptr);
    EXPECT_EQ(Obj->RefCount(), 2);

    // Every older member of a chain is answered by the class that implements the newest.
    IPtr<IGreeter60> Old = QueryAs<IGreeter60>(Counter);
    ASSERT_TRUE(Old);
    EXPECT_EQ(Old->Hello(), "hello");
    EXPECT_EQ(QueryAs<IGreeter70>(Old)->Goodbye(), "goodbye");
    EXPECT_EQ(QueryAs<IGreeter>(Old)->Count(), 3);
    // One identity whichever interface it is reached through.
    EXPECT_TRUE(SameObject<IInterface>(QueryAs<IInterface>(Old).Get(), QueryAs<IInterface>(Counter).Get()));
    EXPECT_EQ(Alive, 1);
  }
  EXPECT_EQ(Alive, 0); // the last release freed it
}

TEST(Interfaces, CheckedCastCountsWhatItGivesAndRaisesWhenTheInterfaceIsMissing) {
  {
    IPtr<TGreeter> Obj = New<TGreeter>();
    IPtr<ICounter> Counter = QueryAs<ICounter>(Obj.Get());
    ASSERT_EQ(Obj->RefCount(), 2);

    // Across the families of one object and down a version chain: one reference each.
    IPtr<IGreeter70> Greeter = CastAs<IGreeter70>(Counter);
    EXPECT_EQ(Obj->RefCount(), 3);
    EXPECT_EQ(Greeter->Goodbye(), "goodbye");
    IPtr<IGreeter> Newest = CastAs<IGreeter>(Obj.Get());
    EXPECT_EQ(Obj->RefCount(), 4);
    EXPECT_EQ(Newest->Count(), 3);
    Greeter = nullptr;
    Newest = nullptr;
    EXPECT_EQ(Obj->RefCount(), 2);

    // A missing interface raises and takes no reference; nothing passes through as nothing.
    try {
      (void)CastAs<IUnrelated>(Counter);
      ADD_FAILURE() << "the cast gave an interface the object does not have";
    } catch (const EIntfCastError& E) {
      EXPECT_EQ(E.Message(), "Interface not supported");
    }
    EXPECT_EQ(Obj->RefCount(), 2);
    EXPECT_EQ(CastAs<ICounter>(IPtr<IGreeter60>()), nullptr);
  }
  EXPECT_EQ(Alive, 0);
}

TEST(Interfaces, AnObjectNobodyHoldsDiesWithTheOutValueOfSupports) {
  auto* Raw = new TGreeter; // count 1 from its constructor, as if New had not adopted it
  Raw->DropOwnReference();
  {
    IPtr<ICounter> Out;
    EXPECT_TRUE(Supports(Raw, Out));
    EXPECT_EQ(Alive, 1);
  }
  EXPECT_EQ(Alive, 0);
}

TEST(Interfaces, SelfRegisteringObjectIsNotKeptAliveByItsRegistration) {
  {
    IPtr<ICounter> Held = NewAs<ICounter, TSelfRegistering>();
    EXPECT_EQ(Listeners().size(), 1u);
    EXPECT_EQ(Alive, 1);
  }
  EXPECT_EQ(Alive, 0);
  EXPECT_TRUE(Listeners().empty());
}

TEST(Interfaces, InterfaceListComparesByIdentityUnderItsLock) {
  IPtr<IInterfaceList> List = NewAs<IInterfaceList, TInterfaceList>();
  IPtr<TGreeter> A = New<TGreeter>();
  IPtr<TGreeter> B = New<TGreeter>();
  List->Add(QueryAs<IInterface>(QueryAs<ICounter>(A.Get())));
  List->Add(QueryAs<IInterface>(QueryAs<IGreeter>(B.Get())));
  EXPECT_EQ(List->GetCount(), 2);
  // Found through another interface of the same object.
  EXPECT_EQ(List->IndexOf(IPtr<IInterface>(QueryAs<IGreeter60>(A.Get()))), 0);
  List->Lock();
  List->Insert(0, List->Get(1));
  List->Unlock();
  EXPECT_EQ(List->IndexOf(IPtr<IInterface>(QueryAs<ICounter>(B.Get()))), 0);
  EXPECT_EQ(List->Remove(IPtr<IInterface>(QueryAs<ICounter>(B.Get()))), 0);
  EXPECT_EQ(List->GetCount(), 2);
  try {
    List->Delete(7);
    FAIL();
  } catch (const EListError& E) {
    EXPECT_EQ(E.Message(), "List index out of bounds (7)");
  }
  List->Clear();
  EXPECT_EQ(List->GetCount(), 0);
  EXPECT_EQ(A->RefCount(), 1);
}

TEST(Interfaces, InterfaceListKeepsItsCountsUnderTwoThreads) {
  IPtr<IInterfaceList> List = NewAs<IInterfaceList, TInterfaceList>();
  IPtr<TGreeter> Shared = New<TGreeter>();
  IPtr<IInterface> Item = QueryAs<IInterface>(QueryAs<ICounter>(Shared.Get()));
  auto Work = [&] {
    for (int I = 0; I < 2000; ++I) {
      List->Add(Item);
      List->Lock(); // a read and a delete as one step
      if (List->GetCount() > 0) List->Delete(List->GetCount() - 1);
      List->Unlock();
    }
  };
  std::thread A(Work), B(Work);
  A.join();
  B.join();
  EXPECT_EQ(List->GetCount(), 0);
  Item = nullptr;
  EXPECT_EQ(Shared->RefCount(), 1); // every reference the list took was given back
}
