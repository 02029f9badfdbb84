//===- tests/inheritance/ProxiesTest.cpp - Classes of designed roots made at run time ===//
#include "inheritance/Proxies.h"

#include "core/root/RootHooks.h"
#include "platform/Classes.h"
#include "platform/ScopeGuard.h"
#include "platform/TypInfo.h"
#include "tests/fakes/Messages.h"

#include <gtest/gtest.h>

#include <vector>

using namespace formkit;
using formkit::fakes::MessageOf;

namespace {

String Op(TOperation Operation) { return Operation == opInsert ? "+" : "-"; }

/// A framework's root base class; records each notification with the class it has then.
class TDesignRoot : public TComponent {
  FK_CLASS(TDesignRoot, TComponent)
  void Notification(TComponent* AComponent, TOperation Operation) override {
    inherited::Notification(AComponent, Operation);
    Heard.push_back(AComponent->Name() + Op(Operation) + ClassName());
  }
  std::vector<String> Heard;
};

class TOtherRoot : public TDesignRoot {
  FK_CLASS(TOtherRoot, TDesignRoot)
};

class TGizmo : public TComponent {
  FK_CLASS(TGizmo, TComponent)
};

/// An owner of designed roots; records each notification with the class `Watched` has then.
class THost : public TComponent {
  FK_CLASS(THost, TComponent)
  void Notification(TComponent* AComponent, TOperation Operation) override {
    inherited::Notification(AComponent, Operation);
    Heard.push_back(AComponent->Name() + Op(Operation) + (Watched ? Watched->ClassName() : String()));
  }
  std::vector<String> Heard;
  TComponent* Watched = nullptr;
};

FK_IMPLEMENT(TDesignRoot, "ProxiesTest") {}
FK_IMPLEMENT(TOtherRoot, "ProxiesTest") {}
FK_IMPLEMENT(TGizmo, "ProxiesTest") {}
FK_IMPLEMENT(THost, "ProxiesTest") {}

void* Token(std::uintptr_t N) { return reinterpret_cast<void*>(N); }

/// A new root of class `T`, moved into proxy `ClassName` on `Metaclass` (its own class
/// when null).
template <class T = TDesignRoot>
T* NewRoot(const String& ClassName, TClass Metaclass = nullptr, TComponent* Owner = nullptr) {
  T* Root = CreateComponentOf<T>(Owner);
  CreateSubClass(Root, ClassName, "Unit" + ClassName.substr(1), Metaclass ? Metaclass : T::StaticClass());
  return Root;
}

/// Every test leaves no proxy behind: a leak here is a release that went missing.
struct ProxiesTest : ::testing::Test {
  void TearDown() override { EXPECT_EQ(ProxyClassCount(), 0); }
};

//===----------------------------------------------------------------------===//
// Identity
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, AProxyIsTheInstancesNewClassOnItsParent) {
  auto* Root = CreateComponentOf<TDesignRoot>(nullptr);
  EXPECT_FALSE(IsProxyClass(Root->ClassType()));
  CreateSubClass(Root, "TForm1", "Unit1", TDesignRoot::StaticClass());
  TClass Proxy = Root->ClassType();
  EXPECT_TRUE(IsProxyClass(Proxy));
  EXPECT_EQ(Root->ClassName(), "TForm1");
  EXPECT_EQ(Root->UnitName(), "Unit1");
  EXPECT_EQ(Root->QualifiedClassName(), "Unit1.TForm1");
  EXPECT_EQ(Proxy->Parent, TDesignRoot::StaticClass());
  EXPECT_TRUE(Root->InheritsFrom(TDesignRoot::StaticClass()));
  EXPECT_EQ(Root->CompiledClass(), TDesignRoot::StaticClass());
  EXPECT_EQ(ProxyEarlierClass(Proxy), TDesignRoot::StaticClass());
  EXPECT_EQ(ProxyReferenceCount(Proxy), 1);
  EXPECT_EQ(ProxyClassCount(), 1);
  // The type information describes the proxy; the properties are the parent's.
  ASSERT_NE(Proxy->TypeInfo(), nullptr);
  EXPECT_EQ(Proxy->TypeInfo()->Kind, tkClass);
  EXPECT_EQ(Proxy->TypeInfo()->Name, "TForm1");
  EXPECT_EQ(GetTypeData(Proxy->TypeInfo())->ClassRef, Proxy);
  EXPECT_EQ(GetTypeData(Proxy->TypeInfo())->IntfUnit, "Unit1");
  EXPECT_EQ(Proxy->Properties(), TDesignRoot::StaticClass()->Properties());
  EXPECT_EQ(Proxy->FindProperty("name"), TDesignRoot::StaticClass()->FindProperty("Name"));
  EXPECT_TRUE(Proxy->Methods.empty());
  Root->Destroy();
  EXPECT_EQ(ProxyClassCount(), 0);
}

TEST_F(ProxiesTest, OnlyLiveProxiesAreProxies) {
  EXPECT_FALSE(IsProxyClass(nullptr));
  EXPECT_FALSE(IsProxyClass(TDesignRoot::StaticClass()));
  // A class made at run time by someone else is not one of them.
  TGeneratedClass Foreign = TClassRec::NewGeneratedClass(TDesignRoot::StaticClass(), "TForeign", "");
  EXPECT_FALSE(IsProxyClass(Foreign.get()));
  EXPECT_EQ(ProxyReferenceCount(Foreign.get()), 0);
  EXPECT_EQ(ProxyEarlierClass(Foreign.get()), nullptr);
  auto* Root = NewRoot("TForm1");
  EXPECT_FALSE(IsProxyClass(Foreign.get()));
  EXPECT_FALSE(IsProxyClass(TDesignRoot::StaticClass()));
  Root->Destroy();
}

TEST_F(ProxiesTest, TheShortFormHasNoUnitAndLongNamesAreCutAtACharacter) {
  auto* Root = CreateComponentOf<TDesignRoot>(nullptr);
  CreateSubClass(Root, "TForm1", TDesignRoot::StaticClass());
  EXPECT_EQ(Root->UnitName(), "");
  EXPECT_EQ(Root->QualifiedClassName(), "TForm1");
  // 254 bytes, then a two-byte character that would end at byte 256.
  String Long = "T" + String(253, 'x') + "\xC3\xA9" + "tail";
  RenameSubClass(Root, Long, "U" + String(300, 'u'));
  EXPECT_EQ(Root->ClassName(), "T" + String(253, 'x'));
  EXPECT_EQ(Root->UnitName().size(), 255u);
  void* Code = CreateSubClassMethod(Root, String(256, 'm'));
  EXPECT_EQ(Root->MethodName(Code), String(255, 'm'));
  Root->Destroy();
}

TEST_F(ProxiesTest, AnInstanceThatDoesNotFitRaisesAndNothingChanges) {
  auto* Root = CreateComponentOf<TDesignRoot>(nullptr);
  auto* Parent = NewRoot<TOtherRoot>("TForm1");
  TClass ParentProxy = Parent->ClassType();
  // A root of the base class cannot become a class of a descendant.
  EXPECT_EQ(MessageOf<EInvalidCast>([&] { CreateSubClass(Root, "TForm2", "Unit2", ParentProxy); }),
            "Class TForm2 does not descend from TDesignRoot");
  EXPECT_EQ(MessageOf<EInvalidCast>([&] { CreateSubClass(Root, "TForm3", "", TGizmo::StaticClass()); }),
            "Class TForm3 does not descend from TDesignRoot");
  EXPECT_EQ(Root->ClassType(), TDesignRoot::StaticClass());
  EXPECT_EQ(ProxyReferenceCount(ParentProxy), 1);
  EXPECT_EQ(ProxyClassCount(), 1);
  Parent->Destroy();
  // The first proxy failing leaves no list behind either.
  EXPECT_THROW(CreateSubClass(Root, "TForm3", "", TGizmo::StaticClass()), EInvalidCast);
  EXPECT_EQ(ProxyClassCount(), 0);
  Root->Destroy();
}

//===----------------------------------------------------------------------===//
// Renaming the class
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, RenamingAClassRenamesItsTypeInformationAndMayKeepTheUnit) {
  auto* Root = NewRoot("TForm1");
  TClass Proxy = Root->ClassType();
  RenameSubClass(Root, "TMainForm", "");
  EXPECT_EQ(Root->ClassName(), "TMainForm");
  EXPECT_EQ(Root->UnitName(), "UnitForm1");
  EXPECT_EQ(Proxy->TypeInfo()->Name, "TMainForm");
  EXPECT_EQ(GetTypeData(Proxy->TypeInfo())->IntfUnit, "UnitForm1");
  RenameSubClass(Root, "TMainForm", "Main");
  EXPECT_EQ(Root->QualifiedClassName(), "Main.TMainForm");
  EXPECT_EQ(GetTypeData(Proxy->TypeInfo())->IntfUnit, "Main");
  EXPECT_EQ(GetTypeData(Proxy->TypeInfo())->ClassRef, Proxy);
  EXPECT_EQ(Root->ClassType(), Proxy); // the same record, renamed
  Root->Destroy();
}

TEST_F(ProxiesTest, RenamingAClassThatIsNoProxyDoesNothing) {
  auto* Plain = CreateComponentOf<TDesignRoot>(nullptr);
  RenameSubClass(Plain, "TRenamed", "Elsewhere");
  EXPECT_EQ(TDesignRoot::StaticClass()->ClassName, "TDesignRoot");
  EXPECT_EQ(TDesignRoot::StaticClass()->UnitName, "ProxiesTest");
  EXPECT_EQ(TDesignRoot::StaticClass()->TypeInfo()->Name, "TDesignRoot");
  Plain->Destroy();
}

//===----------------------------------------------------------------------===//
// Methods and tokens
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, TokensAreTheLowestFreeAndNamesFindThemBothWays) {
  auto* Root = NewRoot("TForm1");
  void* Click = CreateSubClassMethod(Root, "Button1Click");
  void* Show = CreateSubClassMethod(Root, "FormShow");
  EXPECT_EQ(Click, Token(1));
  EXPECT_EQ(Show, Token(2));
  EXPECT_LT(reinterpret_cast<std::uintptr_t>(Show), MaxMethodToken);
  // The same name, in any case, is the same method.
  EXPECT_EQ(CreateSubClassMethod(Root, "Button1Click"), Click);
  EXPECT_EQ(CreateSubClassMethod(Root, "BUTTON1CLICK"), Click);
  EXPECT_EQ(Root->MethodAddress("button1click"), Click);
  EXPECT_EQ(Root->MethodName(Show), "FormShow");
  EXPECT_EQ(Root->MethodName(Token(3)), "");
  EXPECT_TRUE(ExistProxyMethod(Root->ClassType(), "formshow"));
  EXPECT_FALSE(ExistProxyMethod(Root->ClassType(), "FormHide"));
  EXPECT_FALSE(ExistProxyMethod(nullptr, "FormShow"));
  ASSERT_EQ(Root->ClassType()->Methods.size(), 2u);
  EXPECT_EQ(Root->ClassType()->Methods[0].Name, "Button1Click");
  EXPECT_EQ(Root->ClassType()->Methods[0].SignatureId, nullptr);

  // Tokens are shared by all proxies; those of a class that went are given out again.
  auto* Other = NewRoot("TForm2");
  EXPECT_EQ(CreateSubClassMethod(Other, "Button1Click"), Token(3));
  Root->Destroy();
  auto* Third = NewRoot("TForm3");
  EXPECT_EQ(CreateSubClassMethod(Third, "A"), Token(1));
  EXPECT_EQ(CreateSubClassMethod(Third, "B"), Token(2));
  EXPECT_EQ(CreateSubClassMethod(Third, "C"), Token(4));
  Other->Destroy();
  Third->Destroy();
  auto* Fourth = NewRoot("TForm4");
  EXPECT_EQ(CreateSubClassMethod(Fourth, "A"), Token(1));
  Fourth->Destroy();
}

TEST_F(ProxiesTest, RenamingAMethodKeepsItsTokenAndMovesItToTheEnd) {
  auto* Root = NewRoot("TForm1");
  void* Click = CreateSubClassMethod(Root, "Button1Click");
  void* Show = CreateSubClassMethod(Root, "FormShow");
  TMethod Handler{Click, Root}; // as an event property holds it
  RenameSubClassMethod(Root, Click, "OkClick");
  EXPECT_EQ(Root->MethodName(Handler.Code), "OkClick");
  EXPECT_EQ(Root->MethodAddress("OkClick"), Click);
  EXPECT_EQ(Root->MethodAddress("Button1Click"), nullptr);
  std::vector<TMethodEntry>& Table = Root->ClassType()->Methods;
  ASSERT_EQ(Table.size(), 2u);
  EXPECT_EQ(Table[0].Code, Show);
  EXPECT_EQ(Table[1].Name, "OkClick");
  // A token the table does not hold comes in under the new name.
  RenameSubClassMethod(Root, Token(9), "Stray");
  ASSERT_EQ(Table.size(), 3u);
  EXPECT_EQ(Root->MethodAddress("Stray"), Token(9));
  Root->Destroy();
}

TEST_F(ProxiesTest, RemovedMethodsKeepTheirTokensUntilTheClassGoes) {
  auto* Root = NewRoot("TForm1");
  void* Click = CreateSubClassMethod(Root, "Button1Click");
  void* Show = CreateSubClassMethod(Root, "FormShow");
  DestroySubClassMethod(Root, Token(77)); // not there: nothing
  EXPECT_EQ(Root->ClassType()->Methods.size(), 2u);
  DestroySubClassMethod(Root, Click);
  EXPECT_EQ(Root->MethodAddress("Button1Click"), nullptr);
  EXPECT_EQ(Root->MethodName(Click), "");
  EXPECT_EQ(Root->MethodAddress("FormShow"), Show);
  DestroySubClassMethod(Root, Show);
  EXPECT_EQ(Root->MethodAddress("FormShow"), nullptr);
  EXPECT_TRUE(Root->ClassType()->Methods.empty());
  EXPECT_EQ(Root->ClassType()->Methods.capacity(), 0u); // the emptied table is released
  // A fresh table; the removed tokens may still sit in event properties.
  EXPECT_EQ(CreateSubClassMethod(Root, "Button1Click"), Token(3));
  EXPECT_EQ(Root->ClassType()->Methods.size(), 1u);
  Root->Destroy();
  auto* Next = NewRoot("TForm2");
  EXPECT_EQ(CreateSubClassMethod(Next, "X"), Token(1));
  Next->Destroy();
}

TEST_F(ProxiesTest, MethodsOfClassesThatAreNoProxies) {
  auto* Plain = CreateComponentOf<TDesignRoot>(nullptr);
  EXPECT_EQ(CreateSubClassMethod(Plain, "Button1Click"), nullptr);
  EXPECT_TRUE(TDesignRoot::StaticClass()->Methods.empty());
  RenameSubClassMethod(Plain, Token(1), "OkClick");
  DestroySubClassMethod(Plain, Token(1));
  EXPECT_TRUE(TDesignRoot::StaticClass()->Methods.empty());
  // A class made by someone else answers with the methods it has, and takes no new ones.
  TGeneratedClass Foreign = TClassRec::NewGeneratedClass(TDesignRoot::StaticClass(), "TForeign", "");
  Foreign->Methods.push_back({"Known", Token(500), nullptr, nullptr});
  Plain->SetClassType(Foreign.get());
  EXPECT_EQ(CreateSubClassMethod(Plain, "known"), Token(500));
  EXPECT_EQ(CreateSubClassMethod(Plain, "Unknown"), nullptr);
  DestroySubClassMethod(Plain, Token(500));
  EXPECT_EQ(Foreign->Methods.size(), 1u);
  Plain->SetClassType(TDesignRoot::StaticClass());
  Plain->Destroy();
}

TEST_F(ProxiesTest, WhenEveryTokenIsInUseANewMethodRaisesAndNothingChanges) {
  // 256 classes of 256 methods each hold every token from 1 to 0xFFFF but one.
  std::vector<TDesignRoot*> Roots;
  std::uintptr_t Expected = 1;
  for (int R = 0; R < 256; ++R) {
    Roots.push_back(NewRoot("TForm" + std::to_string(R)));
    for (int M = 0; M < 256 && Expected < MaxMethodToken; ++M, ++Expected)
      ASSERT_EQ(CreateSubClassMethod(Roots.back(), "M" + std::to_string(M)), Token(Expected));
  }
  TDesignRoot* Last = Roots.back();
  std::size_t Size = Last->ClassType()->Methods.size();
  EXPECT_EQ(MessageOf<EOutOfResources>([&] { (void)CreateSubClassMethod(Last, "OneTooMany"); }),
            "Too many methods in class TForm255");
  EXPECT_EQ(Last->ClassType()->Methods.size(), Size);
  EXPECT_EQ(Last->MethodAddress("OneTooMany"), nullptr);
  // A method it has is still found.
  EXPECT_EQ(CreateSubClassMethod(Last, "M0"), Token(255 * 256 + 1));
  Roots[3]->Destroy();
  EXPECT_EQ(CreateSubClassMethod(Last, "OneTooMany"), Token(3 * 256 + 1));
  Roots.erase(Roots.begin() + 3);
  for (TDesignRoot* Root : Roots) Root->Destroy();
}

//===----------------------------------------------------------------------===//
// Derived proxies and release
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, ADerivedProxyInheritsTheTokensOfItsParent) {
  auto* Form1 = NewRoot("TForm1");
  void* Click = CreateSubClassMethod(Form1, "Button1Click");
  TClass Proxy1 = Form1->ClassType();
  auto* Form2 = NewRoot("TForm2", Proxy1);
  TClass Proxy2 = Form2->ClassType();
  EXPECT_EQ(Proxy2->Parent, Proxy1);
  EXPECT_TRUE(Form2->InheritsFrom(Proxy1));
  EXPECT_EQ(ProxyReferenceCount(Proxy1), 2);
  EXPECT_EQ(ProxyReferenceCount(Proxy2), 1);
  // An inherited handler keeps the ancestor's token and adds no entry.
  EXPECT_EQ(CreateSubClassMethod(Form2, "button1click"), Click);
  EXPECT_TRUE(Proxy2->Methods.empty());
  EXPECT_FALSE(ExistProxyMethod(Proxy2, "Button1Click"));
  EXPECT_TRUE(ExistProxyMethod(Proxy1, "Button1Click"));
  EXPECT_EQ(Form2->MethodName(Click), "Button1Click");
  // Its own handlers are its own.
  void* Own = CreateSubClassMethod(Form2, "Form2Show");
  EXPECT_EQ(Own, Token(2));
  EXPECT_EQ(Form1->MethodAddress("Form2Show"), nullptr);
  // Renaming the inherited handler in the descendant gives the descendant an entry.
  RenameSubClassMethod(Form2, Click, "OkClick");
  EXPECT_EQ(Form2->MethodName(Click), "OkClick");
  EXPECT_EQ(Form1->MethodName(Click), "Button1Click");
  Form2->Destroy();
  // The descendant's own token is free again; the parent's is not.
  EXPECT_EQ(ProxyReferenceCount(Proxy1), 1);
  EXPECT_EQ(CreateSubClassMethod(Form1, "Another"), Token(2));
  EXPECT_EQ(Form1->MethodName(Click), "Button1Click");
  Form1->Destroy();
}

TEST_F(ProxiesTest, AParentOutlivesItsInstanceWhileADescendantUsesIt) {
  auto* Form1 = NewRoot("TForm1");
  void* Click = CreateSubClassMethod(Form1, "Button1Click");
  TClass Proxy1 = Form1->ClassType();
  auto* Form2 = NewRoot("TForm2", Proxy1);
  Form1->Destroy(); // the ancestor module closes first
  EXPECT_TRUE(IsProxyClass(Proxy1));
  EXPECT_EQ(ProxyReferenceCount(Proxy1), 1);
  EXPECT_EQ(ProxyClassCount(), 2);
  EXPECT_EQ(Form2->MethodName(Click), "Button1Click");
  EXPECT_EQ(Form2->ClassType()->Parent, Proxy1);
  // Its tokens are still in use.
  EXPECT_EQ(CreateSubClassMethod(Form2, "Form2Show"), Token(2));
  Form2->Destroy(); // and the parent goes with the last user
  EXPECT_EQ(ProxyClassCount(), 0);
  auto* Next = NewRoot("TForm3");
  EXPECT_EQ(CreateSubClassMethod(Next, "X"), Token(1));
  Next->Destroy();
}

TEST_F(ProxiesTest, AChainOfThreeGoesInAnyOrder) {
  // Orders of closing the three modules of the chain Form1 <- Form2 <- Form3.
  const std::vector<std::vector<int>> Orders{{0, 1, 2}, {0, 2, 1}, {1, 0, 2}, {1, 2, 0}, {2, 0, 1}, {2, 1, 0}};
  for (const std::vector<int>& Order : Orders) {
    SCOPED_TRACE(::testing::PrintToString(Order));
    std::vector<TDesignRoot*> Forms;
    Forms.push_back(NewRoot("TForm1"));
    Forms.push_back(NewRoot("TForm2", Forms[0]->ClassType()));
    Forms.push_back(NewRoot("TForm3", Forms[1]->ClassType()));
    std::vector<TClass> Classes{Forms[0]->ClassType(), Forms[1]->ClassType(), Forms[2]->ClassType()};
    EXPECT_EQ(ProxyReferenceCount(Classes[0]), 2);
    EXPECT_EQ(ProxyReferenceCount(Classes[1]), 2);
    EXPECT_EQ(ProxyReferenceCount(Classes[2]), 1);
    for (int I : Order) Forms[I]->Destroy();
    EXPECT_EQ(ProxyClassCount(), 0);
  }
}

TEST_F(ProxiesTest, TheMiddleOfAChainStaysWhileTheEndUsesIt) {
  auto* Form1 = NewRoot("TForm1");
  auto* Form2 = NewRoot("TForm2", Form1->ClassType());
  auto* Form3 = NewRoot("TForm3", Form2->ClassType());
  TClass Proxy2 = Form2->ClassType();
  Form2->Destroy();
  EXPECT_TRUE(IsProxyClass(Proxy2));
  EXPECT_EQ(Form3->ClassType()->Parent, Proxy2);
  EXPECT_EQ(ProxyReferenceCount(Proxy2), 1);
  Form3->Destroy(); // releases the middle, which releases the first
  EXPECT_EQ(ProxyClassCount(), 1);
  EXPECT_EQ(ProxyReferenceCount(Form1->ClassType()), 1);
  Form1->Destroy();
}

//===----------------------------------------------------------------------===//
// The earlier class
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, LeavingAProxyGivesTheEarlierClassBack) {
  auto* Root = NewRoot("TForm1");
  DestroySubClass(Root);
  EXPECT_EQ(Root->ClassType(), TDesignRoot::StaticClass());
  EXPECT_EQ(ProxyClassCount(), 0);
  DestroySubClass(Root); // no proxy: nothing
  EXPECT_EQ(Root->ClassType(), TDesignRoot::StaticClass());

  // A proxy over a proxy of the same instance gives back the first, then the class.
  CreateSubClass(Root, "TForm1", "Unit1", TDesignRoot::StaticClass());
  TClass First = Root->ClassType();
  CreateSubClass(Root, "TRenamed", "Unit1", TDesignRoot::StaticClass());
  EXPECT_EQ(ProxyEarlierClass(Root->ClassType()), First);
  EXPECT_EQ(ProxyReferenceCount(First), 1);
  DestroySubClass(Root);
  EXPECT_EQ(Root->ClassType(), First);
  EXPECT_EQ(ProxyClassCount(), 1);
  CreateSubClass(Root, "TAgain", "Unit1", TDesignRoot::StaticClass());
  Root->Destroy(); // leaves both on the way
  EXPECT_EQ(ProxyClassCount(), 0);
}

TEST_F(ProxiesTest, AnotherInstanceMovesIntoAnExistingProxy) {
  auto* Frame1 = NewRoot("TFrame1");
  TClass Proxy = Frame1->ClassType();
  void* Click = CreateSubClassMethod(Frame1, "Button1Click");
  auto* Nested = CreateComponentOf<TDesignRoot>(nullptr);
  ChangeToProxyClass(Nested, Proxy);
  EXPECT_EQ(Nested->ClassType(), Proxy);
  EXPECT_EQ(Nested->MethodName(Click), "Button1Click");
  EXPECT_EQ(ProxyReferenceCount(Proxy), 2);
  // The designed root goes first; the nested instance keeps the class alive.
  Frame1->Destroy();
  EXPECT_TRUE(IsProxyClass(Proxy));
  EXPECT_EQ(Nested->ClassName(), "TFrame1");
  Nested->Destroy();
  EXPECT_EQ(ProxyClassCount(), 0);
}

TEST_F(ProxiesTest, MovingIntoAClassThatIsNoProxyOrDoesNotDescendDoesNothing) {
  auto* Frame1 = NewRoot("TFrame1");
  TClass Proxy = Frame1->ClassType();
  auto* Other = CreateComponentOf<TOtherRoot>(nullptr);
  auto* Gizmo = CreateComponentOf<TGizmo>(nullptr);
  ChangeToProxyClass(Other, TDesignRoot::StaticClass()); // not a proxy
  EXPECT_EQ(Other->ClassType(), TOtherRoot::StaticClass());
  ChangeToProxyClass(Other, Proxy); // the proxy does not descend from TOtherRoot
  EXPECT_EQ(Other->ClassType(), TOtherRoot::StaticClass());
  ChangeToProxyClass(Gizmo, Proxy);
  EXPECT_EQ(Gizmo->ClassType(), TGizmo::StaticClass());
  EXPECT_EQ(ProxyReferenceCount(Proxy), 1);
  // A proxy on a descendant class cannot hold an instance of the base class.
  auto* Derived = NewRoot<TOtherRoot>("TFrame2");
  auto* Base = CreateComponentOf<TDesignRoot>(nullptr);
  EXPECT_EQ(MessageOf<EInvalidCast>([&] { ChangeToProxyClass(Base, Derived->ClassType()); }),
            "Class TFrame2 does not descend from TDesignRoot");
  EXPECT_EQ(Base->ClassType(), TDesignRoot::StaticClass());
  EXPECT_EQ(ProxyReferenceCount(Derived->ClassType()), 1);
  for (TComponent* C : std::vector<TComponent*>{Base, Derived, Gizmo, Other, Frame1}) C->Destroy();
}

TEST_F(ProxiesTest, AnInstanceMovedInByOtherMeansLeavesWithoutReleasing) {
  auto* Frame1 = NewRoot("TFrame1");
  TClass Proxy = Frame1->ClassType();
  auto* Stranger = CreateComponentOf<TDesignRoot>(nullptr);
  Stranger->SetClassType(Proxy); // not counted
  EXPECT_EQ(ProxyReferenceCount(Proxy), 1);
  Stranger->Destroy(); // its class is given back, the count it never took is not released
  EXPECT_EQ(ProxyReferenceCount(Proxy), 1);
  Frame1->Destroy();
}

//===----------------------------------------------------------------------===//
// Notification
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, ARootWithoutOwnerHearsItsNotificationsOnce) {
  auto* Root = NewRoot("TForm1");
  auto* Gizmo = CreateComponentOf<TGizmo>(Root);
  Gizmo->SetName("Gizmo1");
  Gizmo->Destroy();
  EXPECT_EQ(Root->Heard, (std::vector<String>{"+TForm1", "Gizmo1-TForm1"}));
  Root->Destroy();
}

TEST_F(ProxiesTest, AnOwnedRootPassesItsNotificationsToItsOwnerInItsEarlierClass) {
  auto* Host = CreateComponentOf<THost>(nullptr);
  auto* Root = NewRoot("TForm1", nullptr, Host);
  Host->Watched = Root;
  Host->Heard.clear();
  auto* Gizmo = CreateComponentOf<TGizmo>(Root);
  Gizmo->SetName("Gizmo1");
  Gizmo->Destroy();
  // The owner hears of the root's components while the root is in its earlier class.
  EXPECT_EQ(Host->Heard, (std::vector<String>{"+TDesignRoot", "Gizmo1-TDesignRoot"}));
  // The owner passes a removal back to its components, the root among them; the root's
  // own notification follows in its proxy class.
  EXPECT_EQ(Root->Heard, (std::vector<String>{"+TForm1", "Gizmo1-TDesignRoot", "Gizmo1-TForm1"}));
  EXPECT_EQ(Root->ClassName(), "TForm1");
  Host->Watched = nullptr;
  Host->Destroy(); // frees the root, and with it the proxy
}

TEST_F(ProxiesTest, ANestedRootPassesOnlyWhatHappensInsideIt) {
  auto* Host = CreateComponentOf<THost>(nullptr);
  auto* Frame = NewRoot("TFrame1", nullptr, Host);
  Frame->SetInline(true);
  Host->Watched = Frame;
  auto* Inside = CreateComponentOf<TGizmo>(Frame);
  Inside->SetName("Inside");
  auto* Outside = CreateComponentOf<TGizmo>(nullptr);
  Outside->SetName("Outside");
  Frame->FreeNotification(Outside);
  Host->Heard.clear();
  Frame->Heard.clear();
  Outside->Destroy(); // not in the frame: the frame alone hears of it
  EXPECT_TRUE(Host->Heard.empty());
  EXPECT_EQ(Frame->Heard, std::vector<String>{"Outside-TFrame1"});
  Frame->Heard.clear();
  Inside->Destroy(); // in the frame: its owner hears of it too
  EXPECT_EQ(Host->Heard, std::vector<String>{"Inside-TDesignRoot"});
  EXPECT_EQ(Frame->Heard, (std::vector<String>{"Inside-TDesignRoot", "Inside-TFrame1"}));
  Host->Watched = nullptr;
  Host->Destroy();
}

TEST_F(ProxiesTest, ADestroyedRootLeavesItsProxyBeforeItsTeardown) {
  auto* Host = CreateComponentOf<THost>(nullptr);
  auto* Root = NewRoot("TForm1", nullptr, Host);
  Root->SetName("Form1");
  Host->Watched = Root;
  Host->Heard.clear();
  Root->Destroy();
  // The owner hears of the removal with the root already back in its earlier class.
  EXPECT_EQ(Host->Heard, std::vector<String>{"Form1-TDesignRoot"});
  EXPECT_EQ(ProxyClassCount(), 0);
  Host->Watched = nullptr;
  Host->Destroy();
}

//===----------------------------------------------------------------------===//
// The root core's hooks
//===----------------------------------------------------------------------===//

TEST_F(ProxiesTest, TheHooksGiveTheRootCoreTheseClasses) {
  InstallClassProxyHooks();
  auto Remove = Finally([]() noexcept { RemoveClassProxyHooks(); });
  auto* Root = CreateComponentOf<TDesignRoot>(nullptr);
  TRootHooks::CreateSubClass(Root, "TForm1", "Unit1", TDesignRoot::StaticClass());
  EXPECT_TRUE(TRootHooks::IsProxyClass(Root->ClassType()));
  EXPECT_FALSE(TRootHooks::IsProxyClass(TDesignRoot::StaticClass()));
  void* Click = TRootHooks::CreateSubClassMethod(Root, "Button1Click");
  EXPECT_EQ(Click, Token(1));
  TRootHooks::RenameSubClassMethod(Root, Click, "OkClick");
  EXPECT_EQ(Root->MethodName(Click), "OkClick");
  TRootHooks::DestroySubClassMethod(Root, Click);
  EXPECT_EQ(Root->MethodAddress("OkClick"), nullptr);
  TRootHooks::RenameSubClass(Root, "TMainForm", "");
  EXPECT_EQ(Root->QualifiedClassName(), "Unit1.TMainForm");
  auto* Nested = CreateComponentOf<TDesignRoot>(nullptr);
  TRootHooks::ChangeToProxyClass(Nested, Root->ClassType());
  EXPECT_EQ(Nested->ClassName(), "TMainForm");
  Nested->Destroy();
  Root->Destroy();

  RemoveClassProxyHooks();
  EXPECT_FALSE(TRootHooks::CreateSubClass);
  EXPECT_FALSE(TRootHooks::RenameSubClass);
  EXPECT_FALSE(TRootHooks::CreateSubClassMethod);
  EXPECT_FALSE(TRootHooks::RenameSubClassMethod);
  EXPECT_FALSE(TRootHooks::DestroySubClassMethod);
  EXPECT_FALSE(TRootHooks::IsProxyClass);
  EXPECT_FALSE(TRootHooks::ChangeToProxyClass);
}

} // namespace
