//===- tests/inheritance/UpdateObjectsTest.cpp - What still follows the ancestor ---===//
//
// Builds an ancestor form and a descendant form by hand, with inherited child
// components, a sub-object, a collection, references and event handlers, pairs
// them in an update-object tree, and checks what follows the ancestor through
// filtering, updating and reverting.
//
//===----------------------------------------------------------------------===//
#include "inheritance/UpdateFiler.h"
#include "inheritance/UpdateObjects.h"
#include "platform/ScopeGuard.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <memory>

namespace formkit {
namespace {

FK_ENUM(TTone, std::uint8_t, toPale, toMid, toDeep)
FK_SET(TTones, TTone)

/// A sub-object held by a box.
class TFontish : public TPersistent {
  FK_CLASS(TFontish, TPersistent)
  int Size = 8;
  String Face = "Sans";
  void Assign(TPersistent* Source) override {
    auto* Other = dynamic_cast<TFontish*>(Source);
    if (!Other) return inherited::Assign(Source);
    Size = Other->Size;
    Face = Other->Face;
  }
};
FK_IMPLEMENT(TFontish, "UpdateObjectsTest") {
  B.Field("Size", &TFontish::Size);
  B.Field("Face", &TFontish::Face);
}

/// An item with a reference to a component.
class TLinkItem : public TCollectionItem {
  FK_CLASS(TLinkItem, TCollectionItem)
  String Text;
  TComponent* Link = nullptr;
  void Assign(TPersistent* Source) override {
    auto* Other = dynamic_cast<TLinkItem*>(Source);
    if (!Other) return inherited::Assign(Source);
    Text = Other->Text;
    Link = Other->Link;
  }
};
FK_IMPLEMENT(TLinkItem, "UpdateObjectsTest") {
  B.Field("Text", &TLinkItem::Text);
  B.Field("Link", &TLinkItem::Link);
}

/// A container component with a published property of each kind and its own child order.
class TBox : public TComponent {
  FK_CLASS(TBox, TComponent)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    FFont = new TFontish;
    FItems = new TOwnedCollection(this, TLinkItem::StaticClass());
  }
  void BeforeDestruction() override {
    if (FParentBox) FParentBox->Forget(this);
    for (TComponent* Kid : FKids) static_cast<TBox*>(Kid)->FParentBox = nullptr;
    FreeAndNil(FFont);
    FreeAndNil(FItems);
    inherited::BeforeDestruction();
  }

  // Published members -------------------------------------------------------
  String Caption() const { return FCaption; }
  void SetCaption(const String& Value) {
    if (Value == "boom") throw EInvalidOperation("no caption boom");
    FCaption = Value;
  }
  TFontish* Font() const { return FFont; }
  /// Replaces the sub-object, as some frameworks do.
  void SetFont(TFontish* Value) {
    auto* Copy = new TFontish;
    Copy->Assign(Value);
    FFont->Destroy();
    FFont = Copy;
  }
  TOwnedCollection* Items() const { return FItems; }
  void SetItems(TOwnedCollection* Value) { FItems->Assign(Value); }
  int Count() const { return static_cast<int>(FKids.size()); }
  static bool IsDepthStored(TObject* Self) { return static_cast<TBox*>(Self)->FDepth != 0; }
  void Clicked(TObject*) {}
  void Other(TObject*) {}
  /// Names the box whose defined properties cannot be listed, to fail a tree midway.
  static inline String FailingDefinitions;
  void DefineProperties(TFiler* Filer) override {
    if (!FailingDefinitions.empty() && Name() == FailingDefinitions) throw EInvalidOperation("cannot define");
    inherited::DefineProperties(Filer);
  }

  int FWidth = 10;
  int FDepth = 0;
  char FLetter = 'a';
  char16_t FWide = u'w';
  TTone FTone = toMid;
  TTones FTones{toPale};
  double FRatio = 0.5;
  String FCaption;
  WideString FHint;
  std::int64_t FBig = 0;
  TVariant FValue;
  TComponent* FBuddy = nullptr;
  TNotifyEvent FOnClick;

  // Structure ---------------------------------------------------------------
  void Adopt(TBox* Kid) {
    Kid->FParentBox = this;
    FKids.push_back(Kid);
  }
  void GetChildren(const TGetChildProc& Proc, TComponent*) override {
    std::vector<TComponent*> Kids = FKids;
    for (TComponent* Kid : Kids) Proc(Kid);
  }
  void SetChildOrder(TComponent* Child, int Order) override {
    Forget(Child);
    FKids.insert(FKids.begin() + std::min<std::ptrdiff_t>(Order, std::ssize(FKids)), Child);
  }
  void Forget(TComponent* Kid) { FKids.erase(std::remove(FKids.begin(), FKids.end(), Kid), FKids.end()); }
  std::vector<String> KidNames() const {
    std::vector<String> Names;
    for (TComponent* Kid : FKids) Names.push_back(Kid->Name());
    return Names;
  }

  TFontish* FFont = nullptr;
  TOwnedCollection* FItems = nullptr;
  TBox* FParentBox = nullptr;
  std::vector<TComponent*> FKids;
};
FK_IMPLEMENT(TBox, "UpdateObjectsTest") {
  B.Field("Width", &TBox::FWidth);
  B.Field("Depth", &TBox::FDepth).Stored(&TBox::IsDepthStored);
  B.Field("Letter", &TBox::FLetter);
  B.Field("Wide", &TBox::FWide);
  B.Field("Tone", &TBox::FTone);
  B.Field("Tones", &TBox::FTones);
  B.Field("Ratio", &TBox::FRatio);
  B.Property("Caption", &TBox::Caption, &TBox::SetCaption);
  B.Field("Hint", &TBox::FHint);
  B.Field("Big", &TBox::FBig);
  B.Field("Value", &TBox::FValue);
  B.Field("Buddy", &TBox::FBuddy);
  B.Property("Font", &TBox::Font, &TBox::SetFont);
  B.Property("Items", &TBox::Items, &TBox::SetItems);
  B.Property("Count", &TBox::Count);
  B.Event("OnClick", &TBox::FOnClick);
  B.Method<&TBox::Clicked>("Clicked");
  B.Method<&TBox::Other>("Other");
}

/// Records the components an update run brings into the updating state.
struct TRecordingRun : TUpdateRun {
  std::vector<String> Names;
  void Updating(TComponent* Component) override { Names.push_back(Component->Name()); }
};

struct TComponentDeleter {
  void operator()(TComponent* C) const { C->Destroy(); }
};
using TBoxPtr = std::unique_ptr<TBox, TComponentDeleter>;
using Names = std::vector<String>;

TBoxPtr MakeRoot(const char* Name) {
  TBoxPtr Root(CreateComponentOf<TBox>(nullptr));
  Root->SetName(Name);
  return Root;
}

TBox* AddBox(TBox* Root, TBox* Parent, const char* Name, bool Inherited) {
  TBox* Box = CreateComponentOf<TBox>(Root);
  Box->SetName(Name);
  Box->SetAncestor(Inherited);
  Parent->Adopt(Box);
  return Box;
}

TNotifyEvent Handler(TBox* Root, bool Other = false) {
  return Other ? TNotifyEvent::Bind<&TBox::Other>(Root) : TNotifyEvent::Bind<&TBox::Clicked>(Root);
}

PPropInfo Prop(const char* Name) { return GetPropInfo(TBox::StaticClass()->TypeInfo(), Name); }

/// An ancestor form "BaseForm" with Panel1 (holding Button1) and Panel2, and a descendant
/// "DerivedForm" made the same by hand, its components flagged as inherited. Panel1 of
/// both refers to Panel2 of its own form and runs the form's Clicked.
class UpdateObjectsTest : public ::testing::Test {
protected:
  TBoxPtr A = MakeRoot("BaseForm");
  TBoxPtr D = MakeRoot("DerivedForm");
  TBox* APanel1 = AddBox(A.get(), A.get(), "Panel1", false);
  TBox* AButton1 = AddBox(A.get(), APanel1, "Button1", false);
  TBox* APanel2 = AddBox(A.get(), A.get(), "Panel2", false);
  TBox* DPanel1 = AddBox(D.get(), D.get(), "Panel1", true);
  TBox* DButton1 = AddBox(D.get(), DPanel1, "Button1", true);
  TBox* DPanel2 = AddBox(D.get(), D.get(), "Panel2", true);
  std::unique_ptr<TUpdateObject> Tree;
  TRecordingRun Run;

  void SetUp() override {
    APanel1->FBuddy = APanel2;
    DPanel1->FBuddy = DPanel2;
    APanel1->FOnClick = Handler(A.get());
    DPanel1->FOnClick = Handler(D.get());
  }
  void Pair(bool Compare = true) {
    Tree = std::make_unique<TUpdateObject>(nullptr, D.get(), A.get(), nullptr, Compare, true);
  }
  TUpdateObject& Of(TComponent* Component) {
    TUpdateObject* Found = Tree->FindChild(Component);
    EXPECT_NE(Found, nullptr);
    return *Found;
  }
  static Names Followed(const TUpdateObject& U) {
    Names Result;
    for (PPropInfo P : U.PropList()) Result.push_back(P->Name);
    return Result;
  }
  /// Update, as after an edit of the ancestor; then filter, as the descendant's own
  /// modification that follows, which must find nothing overridden.
  void Cycle() {
    Tree->Update(Run);
    Tree->Filter();
  }
};

//===----------------------------------------------------------------------===//
// The tree
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, TheTreeMirrorsInheritedChildrenAndSubObjects) {
  Pair();
  EXPECT_EQ(Tree->Object(), D.get());
  EXPECT_EQ(Tree->ObjectOwner(), D.get());
  EXPECT_EQ(Tree->AncestorOwner(), A.get());
  TUpdateObject& Panel1 = Of(DPanel1);
  EXPECT_EQ(Panel1.Ancestor(), APanel1);
  EXPECT_EQ(Panel1.Owner(), Tree.get());
  EXPECT_EQ(Panel1.ObjectOwner(), D.get());
  EXPECT_EQ(Panel1.AncestorOwner(), A.get());
  EXPECT_TRUE(Panel1.IsComponent());
  EXPECT_EQ(Of(DButton1).Owner(), &Panel1);
  EXPECT_EQ(&Of(APanel2), &Of(DPanel2));   // found by the ancestor's side too
  // Font and Items are sub-objects of each box; then the inherited children.
  ASSERT_EQ(Tree->Children().size(), 4u);
  EXPECT_EQ(Tree->Children()[0]->PropInfo(), Prop("Font"));
  EXPECT_EQ(Tree->Children()[0]->Object(), D->FFont);
  EXPECT_EQ(Tree->Children()[0]->Ancestor(), A->FFont);
  EXPECT_EQ(Tree->Children()[0]->ObjectOwner(), D.get());
  EXPECT_TRUE(Tree->Children()[1]->IsCollection());
  EXPECT_EQ(Tree->FindChildProp(Prop("Items")), Tree->Children()[1]);
  EXPECT_EQ(Tree->FindChildProp(Prop("Width")), nullptr);
  EXPECT_EQ(Tree->FindChildProp(nullptr), nullptr);
  EXPECT_EQ(Tree->Children()[2]->Object(), DPanel1);
  EXPECT_EQ(Tree->Children()[3]->Object(), DPanel2);
}

TEST_F(UpdateObjectsTest, OnlyInheritedChildrenWithATwinGetAnUpdateObject) {
  TBox* Own = AddBox(D.get(), D.get(), "Own", false);           // the descendant's alone
  TBox* Orphan = AddBox(D.get(), D.get(), "Orphan", true);      // no twin of that name
  Pair();
  EXPECT_EQ(Tree->FindChild(Own), nullptr);
  EXPECT_EQ(Tree->FindChild(Orphan), nullptr);
  EXPECT_EQ(Tree->Children().size(), 4u);
}

TEST_F(UpdateObjectsTest, AnUnnamedInheritedChildIsMatchedByComponentIndex) {
  TBox* AUnnamed = AddBox(A.get(), A.get(), "", false);
  TBox* DUnnamed = AddBox(D.get(), D.get(), "", true);
  ASSERT_EQ(AUnnamed->ComponentIndex(), DUnnamed->ComponentIndex());
  Pair();
  EXPECT_EQ(Of(DUnnamed).Ancestor(), AUnnamed);
  AUnnamed->FWidth = 77;
  Tree->Update(Run);
  EXPECT_EQ(DUnnamed->FWidth, 77);
}

TEST_F(UpdateObjectsTest, ComponentDeleteFreesTheComponentsSubtree) {
  Pair();
  EXPECT_FALSE(Tree->ComponentDelete(DPanel1));
  EXPECT_EQ(Tree->FindChild(DPanel1), nullptr);
  EXPECT_EQ(Tree->FindChild(DButton1), nullptr);
  EXPECT_EQ(Tree->Children().size(), 3u);
  EXPECT_FALSE(Tree->ComponentDelete(DPanel1));   // not there any more: nothing happens
  TUpdateObject* Root = Tree.release();
  EXPECT_TRUE(Root->ComponentDelete(D.get()));     // the root frees itself
}

TEST_F(UpdateObjectsTest, ATreeThatFailsMidwayLeavesNothingBehind) {
  TBox::FailingDefinitions = "Button1";
  auto Reset = Finally([]() noexcept { TBox::FailingDefinitions.clear(); });
  try {
    Pair();
    FAIL() << "the failure was lost";
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "cannot define");
  }
  EXPECT_EQ(Tree, nullptr);
  // A child that fails under an existing tree leaves its owner's list as it was.
  TBox::FailingDefinitions.clear();
  Pair();
  TBox::FailingDefinitions = "Panel1";
  EXPECT_THROW(TUpdateObject(Tree.get(), DPanel1, APanel1, nullptr, true, false), EInvalidOperation);
  EXPECT_EQ(Tree->Children().size(), 4u);
}

//===----------------------------------------------------------------------===//
// Published properties
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, AnUntouchedPropertyFollowsAndAnOverriddenOneDoesNot) {
  Pair();
  DPanel1->FWidth = 50;    // the descendant's override
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).Follows("Width"));
  APanel1->FWidth = 99;
  APanel1->FRatio = 2.25;
  APanel2->FWidth = 33;
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FWidth, 50);
  EXPECT_EQ(DPanel1->FRatio, 2.25);
  EXPECT_EQ(DPanel2->FWidth, 33);
}

TEST_F(UpdateObjectsTest, AnOverrideMadeBeforeTheTreeExistsIsNeverFollowed) {
  DPanel1->SetCaption("Mine");
  Pair();
  EXPECT_FALSE(Of(DPanel1).Follows("Caption"));
  APanel1->SetCaption("Theirs");
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->Caption(), "Mine");
}

TEST_F(UpdateObjectsTest, SetBackBeforeAFilterItStillFollows) {
  Pair();
  DPanel1->FWidth = 50;
  DPanel1->FWidth = 10;   // back to the ancestor's value before anything compared
  Tree->Filter();
  APanel1->FWidth = 20;
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FWidth, 20);
}

TEST_F(UpdateObjectsTest, SetBackAfterAFilterItStaysOverriddenUntilReverted) {
  Pair();
  DPanel1->FWidth = 50;
  Tree->Filter();
  DPanel1->FWidth = 10;   // equal to the ancestor's again, by hand
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).Follows("Width"));
  APanel1->FWidth = 20;
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FWidth, 10);
  EXPECT_TRUE(Tree->Revert(DPanel1, Prop("Width")));
  EXPECT_TRUE(Of(DPanel1).Follows("Width"));
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FWidth, 20);
}

TEST_F(UpdateObjectsTest, EveryComparedKindFollows) {
  Pair();
  APanel1->FLetter = 'z';
  APanel1->FWide = u'\u00e9';
  APanel1->FTone = toDeep;
  APanel1->FTones = TTones{toMid, toDeep};
  APanel1->FRatio = -1.5;
  APanel1->SetCaption("Theirs");
  APanel1->FHint = u"wide \u00e9";
  APanel1->SetTag(7);
  Cycle();
  EXPECT_EQ(DPanel1->FLetter, 'z');
  EXPECT_EQ(DPanel1->FWide, u'\u00e9');
  EXPECT_EQ(DPanel1->FTone, toDeep);
  EXPECT_EQ(DPanel1->FTones, (TTones{toMid, toDeep}));
  EXPECT_EQ(DPanel1->FRatio, -1.5);
  EXPECT_EQ(DPanel1->Caption(), "Theirs");
  EXPECT_EQ(DPanel1->FHint, u"wide \u00e9");
  EXPECT_EQ(DPanel1->Tag(), 7);
}

TEST_F(UpdateObjectsTest, EachComparedKindCanBeOverridden) {
  Pair();
  DPanel1->FLetter = 'y';
  DPanel1->FWide = u'v';
  DPanel1->FTone = toPale;
  DPanel1->FTones = TTones{};
  DPanel1->FRatio = 9;
  DPanel1->FHint = u"mine";
  Tree->Filter();
  EXPECT_EQ(Followed(Of(DPanel1)), (Names{"Name", "Tag", "Width", "Depth", "Caption", "Buddy", "Font", "Items", "OnClick"}));
}

TEST_F(UpdateObjectsTest, Int64VariantAndReadOnlyPropertiesAreNotTracked) {
  Pair();
  EXPECT_FALSE(Of(DPanel1).Follows("Big"));
  EXPECT_FALSE(Of(DPanel1).Follows("Value"));
  EXPECT_FALSE(Of(DPanel1).Follows("Count"));
  APanel1->FBig = std::int64_t(1) << 40;
  APanel1->FValue = TVariant(5);
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FBig, 0);
  EXPECT_TRUE(DPanel1->FValue.IsEmpty());
}

TEST_F(UpdateObjectsTest, WithoutComparingTrackedKindsStayEvenWhenTheyDiffer) {
  DPanel1->FWidth = 50;
  DPanel1->FBig = 3;
  Pair(false);
  EXPECT_TRUE(Of(DPanel1).Follows("Width"));
  EXPECT_FALSE(Of(DPanel1).Follows("Big"));
  EXPECT_FALSE(Of(DPanel1).Follows("Count"));
  Tree->Update(Run);   // an object just created from its ancestor takes its values
  EXPECT_EQ(DPanel1->FWidth, 10);
  EXPECT_EQ(DPanel1->FBig, 3);
  Tree->Filter();      // from now on filters compare
  DPanel1->FWidth = 60;
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).Follows("Width"));
}

TEST_F(UpdateObjectsTest, APropertyNotStoredInTheAncestorIsKeptButNotCopied) {
  DPanel1->FDepth = 4;   // the ancestor's 0 is not stored
  Pair();
  EXPECT_TRUE(Of(DPanel1).Follows("Depth"));
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FDepth, 4);
  APanel1->FDepth = 6;   // stored now: compared and copied
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FDepth, 6);
}

TEST_F(UpdateObjectsTest, ASetterThatRaisesEndsTheUpdateAndKeepsTheList) {
  Pair();
  APanel1->FCaption = "boom";
  APanel1->FWidth = 20;     // before Caption in class order
  APanel1->FLetter = 'q';
  AButton1->FWidth = 30;   // below Panel1: not reached
  try {
    Tree->Update(Run);
    FAIL() << "the setter's exception was lost";
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "no caption boom");
  }
  EXPECT_EQ(DPanel1->FWidth, 20);
  EXPECT_EQ(DPanel1->FLetter, 'q');
  EXPECT_EQ(DButton1->FWidth, 10);
  EXPECT_TRUE(Of(DPanel1).Follows("Caption"));
}

TEST_F(UpdateObjectsTest, UpdateBringsEachComponentIntoTheUpdatingState) {
  Pair();
  Tree->Update(Run);
  // Children go from the last to the first.
  EXPECT_EQ(Run.Names, (Names{"DerivedForm", "Panel2", "Panel1", "Button1"}));
}

//===----------------------------------------------------------------------===//
// References and events
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, AReferenceWithinTheFamilyFollowsByName) {
  Pair();
  EXPECT_TRUE(Of(DPanel1).Follows("Buddy"));
  APanel1->FBuddy = AButton1;
  Cycle();
  EXPECT_EQ(DPanel1->FBuddy, DButton1);
  APanel1->FBuddy = nullptr;
  Cycle();
  EXPECT_EQ(DPanel1->FBuddy, nullptr);
}

TEST_F(UpdateObjectsTest, AReferenceToAnAncestorComponentWithoutTwinDoesNotFollow) {
  TBox* Lonely = AddBox(A.get(), A.get(), "Lonely", false);
  APanel1->FBuddy = Lonely;
  Pair();
  EXPECT_FALSE(Of(DPanel1).Follows("Buddy"));
  // With the descendant's value nil it compares equal: the twin is missing there too.
  APanel2->FBuddy = Lonely;
  Tree->Filter();
  EXPECT_TRUE(Of(DPanel2).Follows("Buddy"));
}

TEST_F(UpdateObjectsTest, AReferenceThatLeavesTheFamilyIsComparedAsItIs) {
  TBoxPtr Third = MakeRoot("DataModule");
  TBox* Source = AddBox(Third.get(), Third.get(), "Source", false);
  APanel1->FBuddy = DPanel1->FBuddy = Source;
  Pair();
  EXPECT_TRUE(Of(DPanel1).Follows("Buddy"));
  APanel1->FBuddy = Third.get();
  Cycle();
  EXPECT_EQ(DPanel1->FBuddy, Third.get());
  DPanel1->FBuddy = Source;   // overridden
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).Follows("Buddy"));
  Tree.reset();
}

TEST_F(UpdateObjectsTest, AHandlerOfTheAncestorsRootFollowsAsTheDescendantsRoot) {
  Pair();
  EXPECT_TRUE(Of(DPanel1).Follows("OnClick"));
  APanel1->FOnClick = Handler(A.get(), true);
  Cycle();
  EXPECT_EQ(DPanel1->FOnClick.Method(), Handler(D.get(), true).Method());
  APanel1->FOnClick.Clear();
  Cycle();
  EXPECT_FALSE(DPanel1->FOnClick.IsAssigned());
}

TEST_F(UpdateObjectsTest, AnOverriddenHandlerStaysTheDescendants) {
  Pair();
  DPanel1->FOnClick = Handler(D.get(), true);
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).Follows("OnClick"));
  APanel1->FOnClick.Clear();
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FOnClick.Method(), Handler(D.get(), true).Method());
}

TEST_F(UpdateObjectsTest, AHandlerBoundToAnotherObjectIsComparedAsItIs) {
  APanel1->FOnClick = Handler(APanel2);   // not the root: no translation
  DPanel1->FOnClick = Handler(APanel2);
  Pair();
  EXPECT_TRUE(Of(DPanel1).Follows("OnClick"));
  DPanel1->FOnClick = Handler(DPanel2);
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).Follows("OnClick"));
}

//===----------------------------------------------------------------------===//
// Sub-objects and collections
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, ASubObjectFollowsPropertyByProperty) {
  Pair();
  TUpdateObject& Font = *Of(DPanel1).FindChildProp(Prop("Font"));
  DPanel1->FFont->Size = 12;
  Tree->Filter();
  EXPECT_EQ(Followed(Font), (Names{"Face"}));
  APanel1->FFont->Size = 20;
  APanel1->FFont->Face = "Serif";
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FFont->Size, 12);
  EXPECT_EQ(DPanel1->FFont->Face, "Serif");
}

TEST_F(UpdateObjectsTest, AReplacedSubObjectIsReadAgainBeforeUse) {
  Pair();
  TUpdateObject& Font = *Of(DPanel1).FindChildProp(Prop("Font"));
  TFontish Replacement;
  Replacement.Size = 8;
  Replacement.Face = "Sans";
  DPanel1->SetFont(&Replacement);   // the old sub-object is gone
  APanel1->SetFont(&Replacement);
  APanel1->FFont->Face = "Mono";
  Cycle();
  EXPECT_EQ(Font.Object(), DPanel1->FFont);
  EXPECT_EQ(Font.Ancestor(), APanel1->FFont);
  EXPECT_EQ(DPanel1->FFont->Face, "Mono");
}

TEST_F(UpdateObjectsTest, AnUneditedCollectionFollowsWithItsReferencesMoved) {
  Pair();
  TUpdateObject& Items = *Of(DPanel1).FindChildProp(Prop("Items"));
  EXPECT_TRUE(Items.UpdateCollection());
  auto* Item = static_cast<TLinkItem*>(APanel1->FItems->Add());
  Item->Text = "first";
  Item->Link = APanel2;
  TBoxPtr Third = MakeRoot("Outside");
  auto* Outer = static_cast<TLinkItem*>(APanel1->FItems->Add());
  Outer->Link = Third.get();
  Tree->Update(Run);
  ASSERT_EQ(DPanel1->FItems->Count(), 2);
  auto* Copied = static_cast<TLinkItem*>(DPanel1->FItems->Items(0));
  EXPECT_EQ(Copied->Text, "first");
  EXPECT_EQ(Copied->Link, DPanel2);
  EXPECT_EQ(static_cast<TLinkItem*>(DPanel1->FItems->Items(1))->Link, Third.get());
  Tree->Filter();
  EXPECT_TRUE(Items.UpdateCollection());
  Tree.reset();
}

TEST_F(UpdateObjectsTest, AnEditedCollectionNoLongerFollows) {
  Pair();
  TUpdateObject& Items = *Of(DPanel1).FindChildProp(Prop("Items"));
  static_cast<TLinkItem*>(DPanel1->FItems->Add())->Text = "own";
  Tree->Filter();
  EXPECT_FALSE(Items.UpdateCollection());
  static_cast<TLinkItem*>(APanel1->FItems->Add())->Text = "theirs";
  Tree->Update(Run);
  ASSERT_EQ(DPanel1->FItems->Count(), 1);
  EXPECT_EQ(static_cast<TLinkItem*>(DPanel1->FItems->Items(0))->Text, "own");
  DPanel1->FItems->Clear();   // equal again: it stays out
  static_cast<TLinkItem*>(DPanel1->FItems->Add())->Text = "theirs";
  Tree->Filter();
  EXPECT_FALSE(Items.UpdateCollection());
}

//===----------------------------------------------------------------------===//
// Child order
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, ChildOrderFollowsTheAncestor) {
  Pair();
  A->SetChildOrder(APanel2, 0);
  Tree->Update(Run);
  EXPECT_EQ(D->KidNames(), (Names{"Panel2", "Panel1"}));
  A->SetChildOrder(APanel2, 1);
  Cycle();
  EXPECT_EQ(D->KidNames(), (Names{"Panel1", "Panel2"}));
}

TEST_F(UpdateObjectsTest, AChildTheDescendantMovedLeavesOrderUpdates) {
  TBox* APanel3 = AddBox(A.get(), A.get(), "Panel3", false);
  TBox* DPanel3 = AddBox(D.get(), D.get(), "Panel3", true);
  Pair();
  D->SetChildOrder(DPanel3, 0);   // Panel3, Panel1, Panel2
  Tree->Filter();
  EXPECT_FALSE(Of(DPanel1).UpdateOrder());
  EXPECT_FALSE(Of(DPanel2).UpdateOrder());
  EXPECT_FALSE(Of(DPanel3).UpdateOrder());
  A->SetChildOrder(APanel3, 1);
  Tree->Update(Run);
  EXPECT_EQ(D->KidNames(), (Names{"Panel3", "Panel1", "Panel2"}));
  (void)APanel3;
}

TEST_F(UpdateObjectsTest, TheDescendantsOwnChildrenDoNotCountInTheOrder) {
  AddBox(D.get(), D.get(), "Own", false);
  D->SetChildOrder(D->FindComponent("Own"), 0);   // Own, Panel1, Panel2
  Pair();
  EXPECT_TRUE(Of(DPanel1).UpdateOrder());
  EXPECT_TRUE(Of(DPanel2).UpdateOrder());
  A->SetChildOrder(APanel2, 0);
  Tree->Update(Run);
  EXPECT_EQ(D->KidNames(), (Names{"Own", "Panel2", "Panel1"}));
}

//===----------------------------------------------------------------------===//
// Defined properties
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, TheDesignPositionFollowsThroughDefinedProperties) {
  Pair();
  DPanel2->SetDesignInfo(40);   // Left moved in the descendant
  Tree->Filter();
  APanel1->SetDesignInfo(5 | (6 << 16));
  APanel2->SetDesignInfo(7 | (8 << 16));
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->DesignInfo(), 5 | (6 << 16));
  EXPECT_EQ(DPanel2->DesignInfo(), 40 | (8 << 16));
}

//===----------------------------------------------------------------------===//
// Reverting
//===----------------------------------------------------------------------===//

TEST_F(UpdateObjectsTest, RevertPutsThePropertyBackInClassOrder) {
  Pair();
  DPanel1->FWidth = 1;
  DPanel1->FRatio = 1;
  DPanel1->SetCaption("Mine");
  Tree->Filter();
  EXPECT_EQ(Followed(Of(DPanel1)), (Names{"Name", "Tag", "Depth", "Letter", "Wide", "Tone", "Tones", "Hint", "Buddy", "Font", "Items", "OnClick"}));
  EXPECT_TRUE(Tree->Revert(DPanel1, Prop("Ratio")));
  EXPECT_TRUE(Tree->Revert(DPanel1, Prop("Ratio")));   // once only
  EXPECT_TRUE(Tree->Revert(DPanel1, Prop("Width")));
  EXPECT_EQ(Followed(Of(DPanel1)), (Names{"Name", "Tag", "Width", "Depth", "Letter", "Wide", "Tone", "Tones", "Ratio", "Hint", "Buddy", "Font", "Items", "OnClick"}));
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FWidth, 10);
  EXPECT_EQ(DPanel1->FRatio, 0.5);
  EXPECT_EQ(DPanel1->Caption(), "Mine");
}

TEST_F(UpdateObjectsTest, RevertReachesSubObjectsAndAnswersForUnknownInstances) {
  Pair();
  DPanel1->FFont->Size = 30;
  Tree->Filter();
  EXPECT_TRUE(Tree->Revert(DPanel1->FFont, GetPropInfo(TFontish::StaticClass()->TypeInfo(), "Size")));
  Tree->Update(Run);
  EXPECT_EQ(DPanel1->FFont->Size, 8);
  TBoxPtr Stranger = MakeRoot("Stranger");
  EXPECT_FALSE(Tree->Revert(Stranger.get(), Prop("Width")));
  // A property that is not the class's is not inserted, but the object answered.
  EXPECT_TRUE(Tree->Revert(DPanel1->FFont, Prop("Width")));
  EXPECT_FALSE(Of(DPanel1).FindChildProp(Prop("Font"))->Follows("Width"));
}

TEST_F(UpdateObjectsTest, CanRevertAsksTheObjectOfTheInstance) {
  Pair();
  bool Continue = true;
  EXPECT_TRUE(Tree->CanRevert(DPanel1, Prop("Width"), Continue));
  EXPECT_FALSE(Continue);
  EXPECT_FALSE(Tree->CanRevert(DPanel1, Prop("Count"), Continue));   // no setter
  EXPECT_FALSE(Tree->CanRevert(DPanel1, nullptr, Continue));
  EXPECT_FALSE(Tree->CanRevert(DPanel1, Prop("Depth"), Continue));   // not stored in the ancestor
  EXPECT_FALSE(Continue);
  APanel1->FDepth = 2;
  EXPECT_TRUE(Tree->CanRevert(DPanel1, Prop("Depth"), Continue));
  TBoxPtr Stranger = MakeRoot("Stranger");
  EXPECT_FALSE(Tree->CanRevert(Stranger.get(), Prop("Width"), Continue));
  EXPECT_TRUE(Continue);
}

TEST_F(UpdateObjectsTest, AnObjectWithoutAncestorCannotRevert) {
  TBoxPtr Alone = MakeRoot("Alone");
  TUpdateObject Root(nullptr, Alone.get(), nullptr, nullptr, true, true);
  bool Continue = true;
  EXPECT_FALSE(Root.CanRevert(Alone.get(), Prop("Width"), Continue));
  EXPECT_TRUE(Root.Follows("Width"));   // nothing to compare with
  Root.Filter();
  Root.Update(Run);
  EXPECT_EQ(Alone->FWidth, 10);
}

} // namespace
} // namespace formkit
