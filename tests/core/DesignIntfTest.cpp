//===- tests/core/DesignIntfTest.cpp - The design contract's classes -----===//
#include "core/DesignIntf.h"

#include <gtest/gtest.h>

using namespace formkit;

namespace {

FK_EVENT(TCloseQueryEvent, bool(TObject* Sender, bool& CanClose, const String& Reason, int Code));
FK_EVENT(TSimpleEvent, void(TObject* Sender));

class TEventHost : public TComponent {
  FK_CLASS(TEventHost, TComponent)
  TCloseQueryEvent FOnCloseQuery;
  TSimpleEvent FOnSimple;
};
FK_IMPLEMENT(TEventHost, "Tests") {
  B.Event("OnCloseQuery", &TEventHost::FOnCloseQuery);
  B.Event("OnSimple", &TEventHost::FOnSimple);
}

struct TItem : TCollectionItem {
  FK_CLASS(TItem, TCollectionItem)
};
FK_IMPLEMENT(TItem, "Tests") {}

} // namespace

TEST(EventInfo, DescribesParametersFlagsAndResult) {
  IPtr<IEventInfo> Info = NewAs<IEventInfo, TEventInfo>(GetPropInfo(TEventHost::StaticClass()->TypeInfo(), "OnCloseQuery"));
  EXPECT_EQ(Info->GetMethodKind(), mkFunction);
  ASSERT_EQ(Info->GetParamCount(), 4);
  EXPECT_EQ(Info->GetParamName(0), "Sender");
  EXPECT_EQ(Info->GetParamType(0), "TObject");
  EXPECT_TRUE(Info->GetParamFlags(0).Empty());
  EXPECT_EQ(Info->GetParamName(1), "CanClose");
  EXPECT_EQ(Info->GetParamType(1), "Boolean");
  EXPECT_EQ(Info->GetParamFlags(1), TParamFlags{pfVar});
  EXPECT_EQ(Info->GetParamFlags(2), TParamFlags{pfConst});
  EXPECT_EQ(Info->GetParamType(2), "string");
  EXPECT_EQ(Info->GetParamType(3), "Integer");
  EXPECT_EQ(Info->GetResultType(), "Boolean");
  EXPECT_THROW(Info->GetParamName(4), EListError);

  // A procedure type has an empty result type.
  IPtr<IEventInfo> Simple = NewAs<IEventInfo, TEventInfo>(GetTypeData(TypeInfo<TSimpleEvent>()));
  EXPECT_EQ(Simple->GetMethodKind(), mkProcedure);
  EXPECT_EQ(Simple->GetResultType(), "");

  // The bit of value 16 in the kind byte is cleared; data cut short is refused.
  TTypeData Raw;
  Raw.MethodData = {std::uint8_t(mkFunction | 16), 0, 0};
  IPtr<IEventInfo> Cleared = NewAs<IEventInfo, TEventInfo>(&Raw);
  EXPECT_EQ(Cleared->GetMethodKind(), mkFunction);
  EXPECT_THROW(New<TEventInfo>(static_cast<const TTypeData*>(nullptr)), EArgumentException);
  Raw.MethodData = {0, 2, 0, 3, 'a'};
  try {
    New<TEventInfo>(&Raw);
    FAIL();
  } catch (const EArgumentException& E) {
    EXPECT_EQ(E.Message(), "Invalid method type data");
  }
}

TEST(DesignObjects, WrappersCompareByWhatTheyWrap) {
  TEventHost* Host = CreateComponentOf<TEventHost>(nullptr);
  Host->SetName("Host1");
  TComponent* Child = CreateComponentOf<TComponent>(Host);
  Child->SetName("Child1");
  TObjectGuard<TCollection> Items(new TCollection(TItem::StaticClass()));
  TCollectionItem* Item = Items->Add();

  IPtr<IDesignObject> A = PersistentToDesignObject(Child);
  IPtr<IDesignObject> B = PersistentToDesignObject(Child);
  EXPECT_NE(A.Get(), B.Get()); // a new wrapper each time
  EXPECT_TRUE(A->Equals(B));
  EXPECT_FALSE(A->Equals(PersistentToDesignObject(Host)));
  EXPECT_EQ(A->GetComponentIndex(), 0);
  EXPECT_EQ(A->GetComponentName(), "Child1");
  EXPECT_TRUE(A->GetIsComponent());

  IPtr<IDesignObject> ItemObject = PersistentToDesignObject(Item);
  EXPECT_EQ(ItemObject->GetComponentIndex(), -1);
  EXPECT_EQ(ItemObject->GetComponentName(), "TItem");
  EXPECT_FALSE(ItemObject->GetIsComponent());
  EXPECT_EQ(ItemObject->GetNamePath(), "TCollection[0]");

  // Class wrappers walk up to the topmost class and stop with nil.
  IPtr<IClass> Class = A->GetClassType();
  EXPECT_EQ(Class->GetClassName(), "TComponent");
  EXPECT_EQ(Class->GetUnitName(), "Classes");
  IPtr<IClass> Up = Class->GetClassParent();
  EXPECT_TRUE(Up->ClassNameIs("tpersistent"));
  IPtr<IClass> Top = Up->GetClassParent();
  EXPECT_EQ(Top->GetClassName(), "TObject");
  EXPECT_EQ(Top->GetClassParent(), nullptr);
  Host->Destroy();
}

TEST(DesignObjects, TheObjectFormOfEqualsIsTheIdentityOfTheWrapperItself) {
  TComponent* Child = CreateComponentOf<TComponent>(nullptr);
  IPtr<TDesignObject> A = New<TDesignObject>(Child);
  IPtr<TDesignObject> B = New<TDesignObject>(Child);
  IPtr<IDesignObject> AsDesignObject = PersistentToDesignObject(Child);

  EXPECT_TRUE(A->Equals(static_cast<TObject*>(A.Get())));
  // Neither the wrapped component nor another wrapper of it is this object...
  EXPECT_FALSE(A->Equals(static_cast<TObject*>(Child)));
  EXPECT_FALSE(A->Equals(static_cast<TObject*>(B.Get())));
  EXPECT_FALSE(A->Equals(static_cast<TObject*>(nullptr)));
  // ...though all of them wrap the same instance.
  EXPECT_TRUE(A->Equals(InterfaceOf<IDesignObject>(B.Get())));
  EXPECT_TRUE(A->Equals(AsDesignObject));
  // Through the interface, as tool windows call it.
  IPtr<IDesignObject> Seen = InterfaceOf<IDesignObject>(A.Get());
  EXPECT_TRUE(Seen->Equals(static_cast<TObject*>(A.Get())));
  EXPECT_FALSE(Seen->Equals(static_cast<TObject*>(Child)));
  Child->Destroy();
}

TEST(DesignerSelections, OrderMattersForEquality) {
  TComponent* Owner = CreateComponentOf<TComponent>(nullptr);
  TComponent* X = CreateComponentOf<TComponent>(Owner);
  TComponent* Y = CreateComponentOf<TComponent>(Owner);
  IPtr<IDesignerSelections> First = CreateSelectionList();
  First->Add(X);
  EXPECT_EQ(First->Add(Y), 1);
  IPtr<IDesignerSelections> Copy = NewAs<IDesignerSelections, TDesignerSelections>(First);
  EXPECT_TRUE(Copy->Equals(First));
  IPtr<IDesignerSelections> Reversed = CreateSelectionList();
  Reversed->Add(Y);
  Reversed->Add(X);
  EXPECT_FALSE(Reversed->Equals(First));
  EXPECT_FALSE(First->Equals(nullptr));
  First->Add(X); // no duplicate check
  EXPECT_EQ(First->GetCount(), 3);
  EXPECT_TRUE(First->GetDesignObject(2)->Equals(PersistentToDesignObject(X)));
  EXPECT_THROW(First->Get(3), EListError);
  Owner->Destroy();
}

TEST(Registration, CallsBeforeTheRegistryStartsAreLostSilently) {
  ASSERT_FALSE(RegisterPropertyEditorProc);
  EXPECT_NO_THROW(RegisterPropertyEditor(TypeInfo<int>(), nullptr, "", nullptr));
  EXPECT_NO_THROW(RegisterCustomModule(TComponent::StaticClass(), nullptr));
  EXPECT_NO_THROW(RegisterDesignNotification(nullptr));

  std::vector<String> Seen;
  int SeenGroup = -2;
  RegisterPropertyEditorProc = [&](PTypeInfo Type, TClass Class, const String& Name, TClass Editor) {
    Seen.push_back(Type->Name + "/" + Class->ClassName + "/" + Name + "/" + (Editor ? "editor" : "nil"));
  };
  RegisterCustomModuleProc = [&](int Group, TClass, TClass) { SeenGroup = Group; };
  UnlistPublishedProperty(TEventHost::StaticClass(), "OnSimple");
  UnlistPublishedProperty(TEventHost::StaticClass(), "NoSuchProperty");
  CurrentGroup = 4;
  RegisterCustomModule(TComponent::StaticClass(), nullptr);
  CurrentGroup = -1;
  RegisterPropertyEditorProc = nullptr;
  RegisterCustomModuleProc = nullptr;
  EXPECT_EQ(Seen, std::vector<String>{"TSimpleEvent/TEventHost/OnSimple/nil"});
  EXPECT_EQ(SeenGroup, 4);
  EXPECT_TRUE(GReferenceExpandable);
  EXPECT_TRUE(GShowReadOnlyProps);
}
