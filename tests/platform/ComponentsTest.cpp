//===- tests/platform/ComponentsTest.cpp - Components, owners, registry --===//
#include "tests/platform/SampleComponents.h"
#include "platform/Lists.h"
#include "tests/fakes/Messages.h"

#include <gtest/gtest.h>

using namespace formkit;
using namespace formkit::sample;
using formkit::fakes::MessageOf;


TEST(Construction, FlagsSetBetweenNewInstanceAndCreateAreSeenByTheConstructor) {
  TClass C = TSampleWidget::StaticClass();
  auto* Root = static_cast<TSampleWidget*>(C->NewInstance());
  EXPECT_EQ(Root->FItems, nullptr); // allocated, no constructor logic yet
  Root->SetDesigning(true, true);
  Root->SetDesignInstance(true);
  int Before = TSampleBase::Constructed;
  RunConstructor(Root, nullptr);
  EXPECT_EQ(TSampleBase::Constructed, Before + 1);
  EXPECT_TRUE(Root->SawDesigning);
  EXPECT_TRUE(Root->ComponentState().Contains(csDesignInstance));
  ASSERT_NE(Root->FItems, nullptr);

  // A component created on a designing owner is designing too.
  TComponent* Child = CreateComponent(TSampleWidget::StaticClass(), Root);
  EXPECT_TRUE(static_cast<TSampleWidget*>(Child)->IsDesigning());
  Root->Destroy();
}

TEST(Construction, AThrowingConstructorLeavesNothingBehind) {
  TListener* Owner = CreateComponentOf<TListener>(nullptr);
  EXPECT_EQ(MessageOf<EComponentError>([&] { CreateComponent(TFailingWidget::StaticClass(), Owner); }),
            "cannot build a failing widget");
  EXPECT_EQ(Owner->ComponentCount(), 0); // joined, then left again as the instance was destroyed
  ASSERT_EQ(Owner->Heard.size(), 2u);
  EXPECT_EQ(Owner->Heard[0].second, opInsert);
  EXPECT_EQ(Owner->Heard[1].second, opRemove);

  // The same through NewInstance and RunConstructor: the instance is gone afterwards.
  auto* Instance = static_cast<TComponent*>(TFailingWidget::StaticClass()->NewInstance());
  EXPECT_THROW(RunConstructor(Instance, Owner), EComponentError);
  EXPECT_EQ(Owner->ComponentCount(), 0);
  Owner->Destroy();

  EXPECT_EQ(MessageOf<EInvalidOperation>([] { (void)TStrings::StaticClass()->NewInstance(); }),
            "Cannot create an instance of abstract class TStrings");
  EXPECT_EQ(MessageOf<EComponentError>([] { CreateComponent(TStringList::StaticClass(), nullptr); }),
            "Class TStringList is not a component class");
}

TEST(Ownership, OwnersFreeTheirComponentsLastFirstAndNotify) {
  TListener* Owner = CreateComponentOf<TListener>(nullptr);
  std::vector<String> Order;
  for (const char* Name : {"A", "B", "C"}) CreateComponentOf<TSampleWidget>(Owner)->SetName(Name);
  ASSERT_EQ(Owner->ComponentCount(), 3);
  EXPECT_EQ(Owner->Components(1)->Name(), "B");
  EXPECT_EQ(Owner->Components(2)->ComponentIndex(), 2);
  EXPECT_EQ(MessageOf<EListError>([&] { Owner->Components(3); }), "List index out of bounds (3)");

  // A removed sibling is announced to the owner and to the other owned components.
  auto* Watcher = CreateComponentOf<TListener>(Owner);
  Watcher->SetName("Watcher");
  Owner->FindComponent("b")->Destroy();
  ASSERT_FALSE(Watcher->Heard.empty());
  EXPECT_EQ(Watcher->Heard.back(), (std::pair<String, TOperation>{"B", opRemove}));
  EXPECT_EQ(Owner->FindComponent("B"), nullptr);
  EXPECT_EQ(Owner->ComponentCount(), 3);

  Owner->Components(2)->SetComponentIndex(0);
  EXPECT_EQ(Owner->Components(0)->Name(), "Watcher");
  TComponent* Moved = Owner->FindComponent("A");
  Owner->RemoveComponent(Moved);
  EXPECT_EQ(Moved->Owner(), nullptr);
  Moved->Destroy();
  Owner->Destroy(); // frees the rest; the sanitizer checks nothing leaks
}

TEST(Ownership, FreeNotificationLinksComponentsOfDifferentOwners) {
  TComponent* OwnerA = CreateComponentOf<TComponent>(nullptr);
  TComponent* OwnerB = CreateComponentOf<TComponent>(nullptr);
  auto* Watcher = CreateComponentOf<TListener>(OwnerA);
  auto* Target = CreateComponentOf<TSampleWidget>(OwnerB);
  Target->SetName("Target");
  Watcher->Watched = Target;
  Watcher->FreeNotification(Target);
  EXPECT_TRUE(Target->ComponentState().Contains(csFreeNotification));
  OwnerB->Destroy();
  EXPECT_EQ(Watcher->Watched, nullptr);
  EXPECT_EQ(Watcher->Heard.back(), (std::pair<String, TOperation>{"Target", opRemove}));

  // Once the link is removed, nothing is told.
  TComponent* OwnerC = CreateComponentOf<TComponent>(nullptr);
  auto* Other = CreateComponentOf<TSampleWidget>(OwnerC);
  Watcher->FreeNotification(Other);
  Watcher->RemoveFreeNotification(Other);
  size_t Heard = Watcher->Heard.size();
  OwnerC->Destroy();
  EXPECT_EQ(Watcher->Heard.size(), Heard);
  // The watcher going first unlinks itself from what it watched.
  TComponent* OwnerD = CreateComponentOf<TComponent>(nullptr);
  auto* Last = CreateComponentOf<TSampleWidget>(OwnerD);
  Watcher->FreeNotification(Last);
  OwnerA->Destroy();
  EXPECT_FALSE(Last->ComponentState().Contains(csFreeNotification));
  OwnerD->Destroy();
}

TEST(Names, InvalidAndDuplicateNamesAreRefusedWithTheMessage) {
  TComponent* Owner = CreateComponentOf<TComponent>(nullptr);
  TComponent* A = CreateComponentOf<TComponent>(Owner);
  TComponent* B = CreateComponentOf<TComponent>(Owner);
  A->SetName("Button1");
  EXPECT_EQ(MessageOf<EComponentError>([&] { B->SetName("BUTTON1"); }), "A component named BUTTON1 already exists");
  EXPECT_EQ(MessageOf<EComponentError>([&] { B->SetName("1st"); }), "'1st' is not a valid component name");
  EXPECT_EQ(MessageOf<EComponentError>([&] { B->SetName("a b"); }), "'a b' is not a valid component name");
  EXPECT_EQ(B->Name(), "");
  A->SetName("button1"); // a change of case renames itself
  EXPECT_EQ(Owner->FindComponent("BUTTON1"), A);
  B->ChangeName("Button1"); // no checks at all
  EXPECT_EQ(B->Name(), "Button1");
  A->SetName("");
  EXPECT_EQ(Owner->FindComponent("Button1"), B);
  EXPECT_EQ(Owner->FindComponent(""), nullptr);

  // Inserting a component whose name is taken is refused before it joins.
  TComponent* Loose = CreateComponentOf<TComponent>(nullptr);
  Loose->SetName("Button1");
  EXPECT_THROW(Owner->InsertComponent(Loose), EComponentError);
  EXPECT_EQ(Loose->Owner(), nullptr);
  Loose->Destroy();
  EXPECT_EQ(B->GetNamePath(), "Button1");
  Owner->Destroy();
}

TEST(Collections, ItemsKnowTheirPathAndAssignCopies) {
  auto* W = CreateComponentOf<TSampleWidget>(nullptr);
  W->SetName("Widget1");
  auto* First = static_cast<TSampleItem*>(W->FItems->Add());
  First->Text = "one";
  auto* Second = static_cast<TSampleItem*>(W->FItems->Insert(0));
  Second->Text = "zero";
  EXPECT_EQ(W->FItems->Items(0), Second);
  EXPECT_EQ(First->GetNamePath(), "Widget1.Items[1]");
  EXPECT_EQ(W->FItems->FindItemID(First->ID()), First);
  EXPECT_NE(First->ID(), Second->ID());

  auto* Copy = CreateComponentOf<TSampleWidget>(nullptr);
  Copy->FItems->Assign(W->FItems);
  ASSERT_EQ(Copy->FItems->Count(), 2);
  EXPECT_EQ(static_cast<TSampleItem*>(Copy->FItems->Items(1))->Text, "one");
  // Assigning a component to a collection is refused with the platform's text.
  EXPECT_EQ(MessageOf<EConvertError>([&] { Copy->FItems->Assign(W); }),
            "Cannot assign a TSampleWidget to a TOwnedCollection");
  W->FItems->Delete(0);
  EXPECT_EQ(W->FItems->Count(), 1);
  EXPECT_EQ(MessageOf<EListError>([&] { W->FItems->Items(5); }), "List index out of bounds (5)");
  Copy->Destroy();
  W->Destroy();
}

TEST(Registry, ClassesByNameAndGroups) {
  RegisterSampleClasses();
  EXPECT_EQ(GetClass("tsamplewidget"), TSampleWidget::StaticClass());
  EXPECT_EQ(GetClass("TNowhere"), nullptr);
  EXPECT_EQ(MessageOf<EClassNotFound>([] { FindClass("TNowhere"); }), "Class TNowhere not found");

  // A group of its own for the listener family: its classes are found only while active.
  StartClassGroup(TListener::StaticClass());
  TGeneratedClass SpecialRecord = TClassRec::NewGeneratedClass(TListener::StaticClass(), "TSpecial", "Unit2");
  TClass Special = SpecialRecord.get();
  RegisterClass(Special);
  EXPECT_EQ(ClassGroupOf(Special), TListener::StaticClass());
  EXPECT_EQ(ClassGroupOf(TSampleWidget::StaticClass()), TPersistent::StaticClass());
  EXPECT_EQ(GetClass("TSpecial"), nullptr);

  TClass Previous = ActivateClassGroup(TListener::StaticClass());
  EXPECT_EQ(Previous, TPersistent::StaticClass());
  EXPECT_EQ(CurrentClassGroup(), TListener::StaticClass());
  EXPECT_EQ(GetClass("TSpecial"), Special);
  EXPECT_EQ(GetClass("TSampleWidget"), TSampleWidget::StaticClass()); // the base group stays visible
  // Activating the same group again still answers the previous one.
  EXPECT_EQ(ActivateClassGroup(TListener::StaticClass()), TListener::StaticClass());
  EXPECT_EQ(ActivateClassGroup(Previous), TListener::StaticClass());
  EXPECT_EQ(CurrentClassGroup(), TPersistent::StaticClass());

  TGeneratedClass ClashRecord = TClassRec::NewGeneratedClass(TListener::StaticClass(), "TSpecial", "Unit3");
  TClass Clash = ClashRecord.get();
  EXPECT_EQ(MessageOf<EComponentError>([&] { RegisterClass(Clash); }), "A class named TSpecial already exists");
  UnRegisterClass(Special);
  ActivateClassGroup(TListener::StaticClass());
  EXPECT_EQ(GetClass("TSpecial"), nullptr);
  ActivateClassGroup(Previous);
}

namespace {
struct RecordingDesigner : TInterfacedObject, IDesignerNotify {
  FK_CLASS(RecordingDesigner, TInterfacedObject)
  FK_INTERFACES(IDesignerNotify)
  void Modified() override {}
  void Notification(TPersistent*, TOperation) override {}
  void ValidateRename(TComponent* C, const String& CurName, const String& NewName) override {
    Renames.push_back((C ? C->ClassName() : String("root")) + ":" + CurName + ">" + NewName);
    if (NewName == "Refused") throw EComponentError("refused by the designer");
  }
  std::vector<String> Renames;
};
FK_IMPLEMENT(RecordingDesigner, "Tests") {}
struct TDesignedRoot : TComponent {
  FK_CLASS(TDesignedRoot, TComponent)
  IPtr<IDesignerNotify> GetDesigner() override { return Designer; }
  IPtr<IDesignerNotify> Designer;
};
FK_IMPLEMENT(TDesignedRoot, "Tests") {}
} // namespace

TEST(Registry, RootDesignerAndNestedComponents) {
  auto* Root = CreateComponentOf<TDesignedRoot>(nullptr);
  Root->Designer = New<RecordingDesigner>();
  auto* Frame = CreateComponentOf<TSampleWidget>(Root);
  Frame->SetName("Frame1");
  auto* Inner = CreateComponentOf<TSampleWidget>(Frame);
  Inner->SetName("Button1");
  auto* Item = Inner->FItems->Add();

  EXPECT_EQ(FindRootDesigner(Item), Root->Designer);
  EXPECT_EQ(FindRootDesigner(Inner), Root->Designer);
  auto* Loose = CreateComponentOf<TComponent>(nullptr);
  EXPECT_EQ(FindRootDesigner(Loose), nullptr);
  EXPECT_EQ(FindNestedComponent(Root, "frame1.BUTTON1"), Inner);
  EXPECT_EQ(FindNestedComponent(Root, "Frame1"), Frame);
  EXPECT_EQ(FindNestedComponent(Root, "Frame1.Missing"), nullptr);
  EXPECT_EQ(FindNestedComponent(Root, ""), nullptr);

  std::vector<TClass> NoIcons;
  RegisterNoIcon({TSampleWidget::StaticClass()}); // no hook: nothing happens
  RegisterNoIconProc = [&](const std::vector<TClass>& Classes) { NoIcons = Classes; };
  RegisterNoIcon({TSampleWidget::StaticClass()});
  RegisterNoIconProc = nullptr;
  EXPECT_EQ(NoIcons, std::vector<TClass>{TSampleWidget::StaticClass()});

  // On a design surface the designer is asked about every name, the root's included;
  // off it, it is not.
  auto* Designer = static_cast<RecordingDesigner*>(Root->Designer.Get());
  Inner->SetName("Button2");
  EXPECT_TRUE(Designer->Renames.empty());
  Root->SetDesigning(true);
  Inner->SetName("Button3");
  Root->SetName("Form1");
  EXPECT_THROW(Frame->SetName("Refused"), EComponentError);
  EXPECT_EQ(Frame->Name(), "Frame1");
  EXPECT_EQ(Designer->Renames, (std::vector<String>{"TSampleWidget:Button2>Button3", "root:>Form1",
                                                   "TSampleWidget:Frame1>Refused"}));
  Root->Designer = nullptr;
  Loose->Destroy();
  Root->Destroy();
}

TEST(Ownership, ADestroyedComponentStillReferencedIsReported) {
  std::vector<std::pair<String, int>> Reports;
  auto Saved = DanglingComponentReferenceHook;
  DanglingComponentReferenceHook = [&](const String& Name, int Count) { Reports.emplace_back(Name, Count); };
  auto* C = CreateComponentOf<TSampleWidget>(nullptr);
  IInterface* Held = static_cast<IInterface*>(C);
  Held->AddRef();
  C->Destroy();
  DanglingComponentReferenceHook = Saved;
  ASSERT_EQ(Reports.size(), 1u);
  EXPECT_EQ(Reports[0], (std::pair<String, int>{"TSampleWidget", 1}));
  Held->Release(); // the last reference frees what the teardown kept
}

TEST(Names, FindComponentAgreesWithAReferenceThroughRenamesAndRemovals) {
  TComponent* Owner = CreateComponentOf<TComponent>(nullptr);
  std::vector<TComponent*> All;
  for (int I = 0; I < 600; ++I) {
    All.push_back(CreateComponentOf<TComponent>(Owner));
    All.back()->SetName("Item" + std::to_string(I));
  }
  // Rename every third, free every fifth, then re-use freed names: tombstones and growth.
  for (int I = 0; I < 600; I += 3) All[static_cast<size_t>(I)]->SetName("Renamed" + std::to_string(I));
  for (int I = 0; I < 600; I += 5) {
    All[static_cast<size_t>(I)]->Destroy();
    All[static_cast<size_t>(I)] = nullptr;
  }
  for (int I = 0; I < 600; I += 5) {
    All[static_cast<size_t>(I)] = CreateComponentOf<TComponent>(Owner);
    All[static_cast<size_t>(I)]->SetName("ITEM" + std::to_string(I));
  }
  for (int I = 0; I < 600; ++I) {
    TComponent* C = All[static_cast<size_t>(I)];
    EXPECT_EQ(Owner->FindComponent(C->Name()), C) << I;
    EXPECT_EQ(Owner->FindComponent(LowerCase(C->Name())), C) << I;
    if (I % 3 == 0 && I % 5 != 0) {
      EXPECT_EQ(Owner->FindComponent("Item" + std::to_string(I)), nullptr) << I;
    }
  }
  EXPECT_EQ(Owner->FindComponent("Item600"), nullptr);
  Owner->Destroy();
}

namespace {
/// Counts the updates its collection reports.
class TCountingCollection : public TOwnedCollection {
  FK_CLASS(TCountingCollection, TOwnedCollection)
  using TOwnedCollection::TOwnedCollection;
  std::vector<TCollectionItem*> Updates;

protected:
  void Update(TCollectionItem* Item) override { Updates.push_back(Item); }
};
FK_IMPLEMENT(TCountingCollection, "Tests") {}
} // namespace

TEST(Collections, ChangesAreReportedOnceAfterABatchAndItemsMove) {
  TObjectGuard<TCountingCollection> Items(new TCountingCollection(nullptr, TSampleItem::StaticClass()));
  TCollectionItem* First = Items->Add();
  EXPECT_EQ(Items->Updates, std::vector<TCollectionItem*>{nullptr});
  Items->Updates.clear();
  Items->BeginUpdate();
  Items->Add();
  Items->Add();
  Items->BeginUpdate();
  Items->Delete(1);
  Items->EndUpdate();
  EXPECT_TRUE(Items->Updates.empty()); // inside the outer batch nothing is told
  Items->EndUpdate();
  EXPECT_EQ(Items->Updates, std::vector<TCollectionItem*>{nullptr});
  Items->Updates.clear();
  // Moving an item reports a change of all; moving to an index out of range is refused.
  TCollectionItem* Last = Items->Items(1);
  Last->SetIndex(0);
  EXPECT_EQ(Items->Items(0), Last);
  EXPECT_EQ(First->Index(), 1);
  EXPECT_EQ(Items->Updates, std::vector<TCollectionItem*>{nullptr});
  EXPECT_EQ(MessageOf<EListError>([&] { Last->SetIndex(5); }), "List index out of bounds (5)");
  EXPECT_EQ(Last->Index(), 0);
  // An item moved into another collection leaves the first.
  TObjectGuard<TCountingCollection> Other(new TCountingCollection(nullptr, TSampleItem::StaticClass()));
  First->SetCollection(Other.Get());
  EXPECT_EQ(Items->Count(), 1);
  EXPECT_EQ(Other->Items(0), First);
  EXPECT_EQ(Items->FindItemID(First->ID()), nullptr);
}
