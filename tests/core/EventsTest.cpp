//===- tests/core/EventsTest.cpp - Multicast events ----------------------===//
#include "core/Events.h"

#include <gtest/gtest.h>

using namespace formkit;

namespace {

/// A handler object that records its calls in a shared order list.
struct THandler : TObject {
  THandler(String Name, std::vector<String>* Order) : Name(std::move(Name)), Order(Order) {}
  void Notify(TObject*) {
    Order->push_back(Name);
    if (OnCall) OnCall();
  }
  void Renamed(TObject*, const String& Cur, const String& New) { Order->push_back(Name + ":" + Cur + ">" + New); }
  void Value(int V) { Order->push_back(Name + "=" + std::to_string(V)); }
  TNotifyEvent Method() { return TNotifyEvent::Bind<&THandler::Notify>(this); }
  String Name;
  std::vector<String>* Order;
  std::function<void()> OnCall;
};

} // namespace

TEST(Event, SendCallsFromTheLastToTheFirstAndRemembersThatItRan) {
  std::vector<String> Order;
  THandler A("A", &Order), B("B", &Order), C("C", &Order);
  TObjectGuard<TEvent> E(new TEvent);
  E->Add(A.Method());
  E->Add(B.Method());
  E->Add(C.Method());
  EXPECT_FALSE(E->Executed());
  E->Send(nullptr);
  EXPECT_EQ(Order, (std::vector<String>{"C", "B", "A"}));
  EXPECT_TRUE(E->Executed());
}

TEST(Event, DuplicatesForceAddAndRemovalOfAnAbsentHandler) {
  std::vector<String> Order;
  THandler A("A", &Order);
  TObjectGuard<TEvent> E(new TEvent);
  E->Add(A.Method());
  E->Add(A.Method());
  EXPECT_EQ(E->Count(), 1);
  E->ForceAdd(A.Method());
  EXPECT_EQ(E->Count(), 2);
  E->Remove(A.Method());
  EXPECT_EQ(E->Count(), 1);
  E->Remove(A.Method());
  E->Remove(A.Method()); // absent: nothing happens
  EXPECT_EQ(E->Count(), 0);
  EXPECT_EQ(E->IndexOf(A.Method()), -1);
}

TEST(Event, AHandlerThatRemovesItselfNeitherSkipsNorRepeatsAnother) {
  std::vector<String> Order;
  THandler A("A", &Order), B("B", &Order), C("C", &Order), D("D", &Order);
  TObjectGuard<TEvent> E(new TEvent);
  for (THandler* H : {&A, &B, &C, &D}) E->Add(H->Method());
  C.OnCall = [&] { E->Remove(C.Method()); };
  D.OnCall = [&] { E->Remove(D.Method()); };
  E->Send(nullptr);
  EXPECT_EQ(Order, (std::vector<String>{"D", "C", "B", "A"}));
  Order.clear();
  E->Send(nullptr);
  EXPECT_EQ(Order, (std::vector<String>{"B", "A"}));
}

TEST(Event, TypedEventsCarryTheirArguments) {
  std::vector<String> Order;
  THandler A("A", &Order), B("B", &Order);
  TObjectGuard<TEvComponentRenamedEvent> E(new TEvComponentRenamedEvent);
  E->Add(TComponentRenamedEvent::Bind<&THandler::Renamed>(&A));
  E->Add(TComponentRenamedEvent::Bind<&THandler::Renamed>(&B));
  E->Send(nullptr, "Button1", "OkButton");
  EXPECT_EQ(Order, (std::vector<String>{"B:Button1>OkButton", "A:Button1>OkButton"}));
}

TEST(EventT, CallsInOrderOfRegistrationWithoutDuplicateChecks) {
  std::vector<String> Order;
  THandler A("A", &Order), B("B", &Order);
  TEvent1<int> E;
  using H = TEvent1<int>::THandler;
  E.Add(H::Bind<&THandler::Value>(&A));
  E.Add(H::Bind<&THandler::Value>(&B));
  E.Add(H::Bind<&THandler::Value>(&A));
  E.Send(7);
  EXPECT_EQ(Order, (std::vector<String>{"A=7", "B=7", "A=7"}));
  E.Remove(H::Bind<&THandler::Value>(&A));
  Order.clear();
  E.Send(1);
  EXPECT_EQ(Order, (std::vector<String>{"B=1", "A=1"}));
  E.Clear();
  E.Send(2);
  EXPECT_EQ(Order.size(), 2u);
}
