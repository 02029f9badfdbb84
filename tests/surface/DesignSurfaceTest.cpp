//===- tests/surface/DesignSurfaceTest.cpp - What the base surface keeps and forwards ===//
#include "surface/DragBoxes.h"
#include "surface/Surface.h"
#include "tests/fakes/CallLog.h"
#include "tests/fakes/FakeRoot.h"

#include <gtest/gtest.h>

namespace formkit::fakes {
namespace {

/// The module's side: each call a line in the log.
class TLoggingHost : public TInterfacedObject, public ISurfaceHost {
  FK_CLASS(TLoggingHost, TInterfacedObject)
  FK_INTERFACES(ISurfaceHost)
  explicit TLoggingHost(TCallLog* Log = nullptr) : FLog(Log) {}
  std::vector<TComponent*> Selectable;

  void Dialog(TDesignDialog Kind) override { FLog->Add("Dialog(" + GetEnumName(TypeInfo<TDesignDialog>(), Kind) + ")"); }
  void Command(TDesignCommand Kind) override {
    FLog->Add("Command(" + GetEnumName(TypeInfo<TDesignCommand>(), Kind) + ")");
  }
  void DeleteSelection() override { FLog->Add("DeleteSelection"); }
  void Modified() override { FLog->Add("Modified"); }
  void ValidateModification() override { FLog->Add("ValidateModification"); }
  String UniqueName(const String& BaseName) override { return BaseName + "7"; }
  void CanInsertComponent(TComponent* C) override { FLog->Add("CanInsertComponent(" + C->Name() + ")"); }
  void InstanceInserted(TPersistent* P) override { FLog->Add("InstanceInserted(" + P->GetNamePath() + ")"); }
  void InstanceRemoved(TPersistent* P) override { FLog->Add("InstanceRemoved(" + P->GetNamePath() + ")"); }
  int GetSelectableComponentCount() override { return static_cast<int>(Selectable.size()); }
  TComponent* GetSelectableComponents(int Index) override { return Selectable.at(static_cast<std::size_t>(Index)); }

private:
  TCallLog* FLog;
};

/// A designer that tells how it was asked to create the armed tool.
class TCreatingRoot : public TFakeRoot {
  FK_CLASS(TCreatingRoot, TFakeRoot)
  TCreatingRoot() : TFakeRoot("Form1", nullptr) {}
  TCreatingRoot(TCallLog* Log) : TFakeRoot("Form1", Log), FLog(Log) {}
  TComponent* CreateCurrentComponentScaled(TComponent* Parent, const TRect& R, bool Scaled) override {
    FLog->Add("Create(" + (Parent ? Parent->Name() : String("nil")) + "," + std::to_string(R.Left) + "," +
              (Scaled ? "scaled" : "as is") + ")");
    return Parent;
  }

private:
  TCallLog* FLog = nullptr;
};

/// The surface a framework would write, with only what the base leaves open.
class TBareSurface : public TDesignSurface {
  FK_CLASS(TBareSurface, TDesignSurface)
  IPtr<IDragBoxes> BeginDrag(const IPtr<IItem>&, const TPoint&) override { return nullptr; }
  TPoint GetCursorPoint() override { return {}; }
  TPoint DesignToGlobal(const TPoint& P) override { return P; }
  IPtr<IItem> FindNextItem(const IPtr<IItem>&, bool) override { return nullptr; }
  void FocusSurface() override {}
  TPoint GetOrigin() override { return {}; }
  TPoint GlobalToDesign(const TPoint& P) override { return P; }
  IPtr<IItem> ItemAtPoint(int, int) override { return nullptr; }
  void ShowContextMenu() override {}
  IPtr<IItem> ItemFromComponent(TComponent* C) override { return C ? NewAs<IItem, TPersistentItem>(C) : nullptr; }
  void SetHandles(IPtr<IGrabHandles> Handles) { FGrabHandles = std::move(Handles); }
};

/// A helper the surface owns; tells when it goes.
class TOwnedHelper : public TObject {
  FK_CLASS(TOwnedHelper, TObject)
  TOwnedHelper() = default;
  TOwnedHelper(TCallLog* Log, String Name) : FLog(Log), FName(std::move(Name)) {}
  void BeforeDestruction() override {
    FLog->Add("free " + FName);
    inherited::BeforeDestruction();
  }

private:
  TCallLog* FLog = nullptr;
  String FName;
};

/// Handles that do nothing: the surface only keeps them.
class TIdleHandles : public TInterfacedObject, public IGrabHandles {
  FK_CLASS(TIdleHandles, TInterfacedObject)
  FK_INTERFACES(IGrabHandles)
  IPtr<IItem> GetAttachedItem() override { return nullptr; }
  void AttachHandles(const IPtr<IItem>&) override {}
  void SetHandlesActive(bool) override {}
  TMoveAffects HandleAtPoint(int, int) override { return {}; }
  void RefreshHandles() override {}
};

FK_IMPLEMENT(TLoggingHost, "Tests") {}
FK_IMPLEMENT(TCreatingRoot, "Tests") {}
FK_IMPLEMENT(TBareSurface, "Tests") {}
FK_IMPLEMENT(TOwnedHelper, "Tests") {}
FK_IMPLEMENT(TIdleHandles, "Tests") {}

struct DesignSurfaceTest : ::testing::Test {
  TCallLog Log;
  IPtr<TLoggingHost> Host = New<TLoggingHost>(&Log);
  IPtr<TCreatingRoot> Root = New<TCreatingRoot>(&Log);
  IPtr<TBareSurface> Surface = New<TBareSurface>();
  void SetUp() override {
    Surface->Create(IPtr<IDesigner>(static_cast<IDesigner*>(Root.Get())), Root->GetRoot(), InterfaceOf<ISurfaceHost>(Host.Get()));
  }
};

TEST_F(DesignSurfaceTest, TheMenuHandlersAndEditingCallsReachTheHostInOrder) {
  Surface->AlignToGrid(nullptr);
  Surface->AppFlipChildrenAll(nullptr);
  Surface->AppFlipChildrenSelected(nullptr);
  Surface->AppTextLYT(nullptr);
  Surface->AppViewAsText(nullptr);
  Surface->RevertComponent(nullptr);
  Surface->AppShowNonVisualComponents(nullptr);
  Surface->AppAlignDialog(nullptr);
  Surface->AppSizeDialog(nullptr);
  Surface->AppScaleDialog(nullptr);
  Surface->AppTabOrderDialog(nullptr);
  Surface->AppCreationOrderDialog(nullptr);
  Surface->AppSaveTemplateDialog(nullptr);
  Surface->SelectionVerb(nullptr); // nothing in the base
  Surface->DeleteSelection();
  Surface->ValidateModification();
  Surface->Modified();
  Surface->CanInsertComponent(Root->GetRoot());
  Surface->Notification(Root->GetRoot(), opInsert);
  Surface->Notification(Root->GetRoot(), opRemove);
  EXPECT_EQ(Surface->UniqueName("Button"), "Button7");
  EXPECT_EQ(Log.Calls, (std::vector<String>{
                             "Command(dmAlignToGrid)", "Command(dmFlipAllChildren)", "Command(dmFlipSelectedChildren)",
                             "Command(dmTextLYT)", "Command(dmViewAsText)", "Command(dmRevert)",
                             "Command(dmShowNonVisualComponents)", "Dialog(ddAlign)", "Dialog(ddSize)",
                             "Dialog(ddScale)", "Dialog(ddTabOrder)", "Dialog(ddCreationOrder)",
                             "Dialog(ddSaveTemplate)", "DeleteSelection", "ValidateModification", "Modified",
                             "CanInsertComponent(Form1)", "InstanceInserted(Form1)", "InstanceRemoved(Form1)"}));
}

TEST_F(DesignSurfaceTest, ItemsComeFromTheHostsSelectableComponentsAndCreationFromTheDesigner) {
  TComponent* A = CreateComponentOf<TComponent>(Root->GetRoot());
  A->SetName("A1");
  TComponent* B = CreateComponentOf<TComponent>(Root->GetRoot());
  B->SetName("B1");
  Host->Selectable = {B, A};
  ASSERT_EQ(Surface->GetItemsCount(), 2);
  EXPECT_EQ(ExtractComponent(Surface->GetItems(0)), B);
  EXPECT_EQ(ExtractComponent(Surface->GetItems(1)), A);
  // The parent's component, the rectangle and the scaling go to the designer.
  IPtr<IItem> Made = Surface->CreateItem(Surface->ItemFromComponent(A), Rect(16, 0, 40, 20), false);
  EXPECT_EQ(ExtractComponent(Made), A);
  EXPECT_EQ(Log.Calls.back(), "Create(A1,16,as is)");
  Surface->CreateItem(nullptr, Rect(8, 0, 9, 9), true);
  EXPECT_EQ(Log.Calls.back(), "Create(nil,8,scaled)");
  // Destroying an item deletes what it stands for.
  Surface->DestroyItem(Surface->GetItems(0));
  EXPECT_EQ(Root->GetRoot()->FindComponent("B1"), nullptr);
}

TEST_F(DesignSurfaceTest, TheBaseKeepsItsStateAndAnswersTheDesignerByDelegation) {
  EXPECT_FALSE(Surface->GridSnapDisabled());
  EXPECT_FALSE(Surface->GetIsControl());
  Surface->SetIsControl(true);
  EXPECT_FALSE(Surface->GetIsControl());
  EXPECT_FALSE(Surface->IsView());
  EXPECT_EQ(Surface->GetDesignRoot(), Root->GetRoot());
  // One listener; removing clears it whatever is passed.
  IPtr<IDesignSurfaceListener> None;
  Surface->RemoveListener(None);
  EXPECT_FALSE(Surface->Listener());
  // Options are kept.
  TDesignSurfaceOptions Options;
  Options.GridSize = {4, 6};
  Options.DisplayGrid = false;
  Options.ShowComponentCaptions = true;
  Options.ShowNonVisualComponents = false;
  Surface->SetOptions(Options);
  EXPECT_EQ(Surface->GridSize(), (TPoint{4, 6}));
  EXPECT_FALSE(Surface->DisplayGrid());
  EXPECT_TRUE(Surface->ShowCaptions());
  EXPECT_FALSE(Surface->ShowNonVisualComponents());
  Surface->SetInitializing(true);
  EXPECT_TRUE(Surface->Initializing());
  // The surface answers as the designer; the identity stays the surface's.
  IPtr<IDesigner> AsDesigner = QueryAs<IDesigner>(IPtr<IDesignSurface>(Surface.Get()));
  EXPECT_EQ(AsDesigner.Get(), IPtr<IDesigner>(static_cast<IDesigner*>(Root.Get())).Get());
  EXPECT_EQ(QueryAs<IDesignSurfaceNotify>(IPtr<IDesignSurface>(Surface.Get())).Get(),
            static_cast<IDesignSurfaceNotify*>(Surface.Get()));
  // A host is replaced only by another one.
  IPtr<TLoggingHost> Other = New<TLoggingHost>(&Log);
  Surface->SetHost(InterfaceOf<ISurfaceHost>(Other.Get()));
  EXPECT_EQ(Surface->Host().Get(), static_cast<ISurfaceHost*>(Other.Get()));
}

TEST_F(DesignSurfaceTest, CloseDropsTheHandlesAndTheOwnedHelpersGoLastFirst) {
  Surface->SetHandles(NewAs<IGrabHandles, TIdleHandles>());
  EXPECT_TRUE(Surface->GetGrabHandles());
  Surface->Close();
  EXPECT_FALSE(Surface->GetGrabHandles());
  Surface->AddContainer(TObjectGuard<TOwnedHelper>(new TOwnedHelper(&Log, "first")));
  Surface->AddContainer(TObjectGuard<TOwnedHelper>(new TOwnedHelper(&Log, "second")));
  EXPECT_EQ(Surface->ContainerCount(), 2);
  Surface = nullptr;
  EXPECT_EQ(Log.Calls, (std::vector<String>{"free second", "free first"}));
}

} // namespace
} // namespace formkit::fakes
