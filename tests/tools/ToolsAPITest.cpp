//===- tests/tools/ToolsAPITest.cpp - General tool interface helpers -----===//
//
// The global service object and what asks it for services, the wizard hook,
// the notifier bases and the file object handed to the host.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.h"

#include <gtest/gtest.h>

#include <vector>

using namespace formkit;

namespace {

//===----------------------------------------------------------------------===//
// Fakes of the host's side
//===----------------------------------------------------------------------===//

class TProject : public TInterfacedObject, public IOTAProject {
  FK_CLASS(TProject, TInterfacedObject)
  FK_INTERFACES(IOTAProject)
  String GetFrameworkType() override { return "Kiln"; }
};
FK_IMPLEMENT(TProject, "ToolsAPITest") {}

/// A service object that offers no service.
class TBareServices : public TInterfacedObject, public IHalvernIDEServices {
  FK_CLASS(TBareServices, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices)
};
FK_IMPLEMENT(TBareServices, "ToolsAPITest") {}

/// A service object with module services and personality services.
class TFullServices : public TInterfacedObject,
                      public IHalvernIDEServices,
                      public IOTAModuleServices,
                      public IOTAPersonalityServices {
  FK_CLASS(TFullServices, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTAModuleServices, IOTAPersonalityServices)

  IPtr<IOTAProject> ActiveProject;

  int AddFileSystem(const IPtr<IOTAFileSystem>&) override { return -1; }
  IPtr<IOTAModule> CreateModule(const IPtr<IOTACreator>&) override { return nullptr; }
  IPtr<IOTAModule> FindModule(const String&) override { return nullptr; }
  int GetModuleCount() override { return 0; }
  IPtr<IOTAModule> GetModule(int) override { return nullptr; }
  IPtr<IOTAProjectGroup> GetMainProjectGroup() override { return nullptr; }
  void RemoveFileSystem(int) override {}
  IPtr<IOTAProject> GetActiveProject() override { return ActiveProject; }
};
FK_IMPLEMENT(TFullServices, "ToolsAPITest") {}

class TWizard : public TInterfacedObject, public IOTAWizard {
  FK_CLASS(TWizard, TInterfacedObject)
  FK_INTERFACES(IOTAWizard)
};
FK_IMPLEMENT(TWizard, "ToolsAPITest") {}

/// Every test leaves the globals as it found them: empty.
class ToolsAPIServices : public ::testing::Test {
protected:
  void TearDown() override {
    HalvernIDEServices = nullptr;
    LibraryWizardProc = nullptr;
  }
};

//===----------------------------------------------------------------------===//
// The global service object
//===----------------------------------------------------------------------===//

TEST_F(ToolsAPIServices, WithoutTheServiceObjectEveryServiceIsAbsent) {
  ASSERT_FALSE(HalvernIDEServices);
  EXPECT_NO_THROW(EXPECT_EQ(GetActiveProject(), nullptr));
  EXPECT_EQ(PersonalityServices(), nullptr);
}

TEST_F(ToolsAPIServices, ServicesTheHostDoesNotOffer) {
  HalvernIDEServices = New<TBareServices>();
  EXPECT_EQ(PersonalityServices(), nullptr);
  // The active project comes through a checked cast to the module services.
  EXPECT_THROW(GetActiveProject(), EIntfCastError);
}

TEST_F(ToolsAPIServices, ServicesTheHostOffers) {
  IPtr<TFullServices> Host = New<TFullServices>();
  HalvernIDEServices = IPtr<IHalvernIDEServices>(Host);

  EXPECT_EQ(GetActiveProject(), nullptr); // no project open
  Host->ActiveProject = New<TProject>();
  IPtr<IOTAProject> Project = GetActiveProject();
  ASSERT_TRUE(Project);
  EXPECT_EQ(Project, Host->ActiveProject);
  EXPECT_EQ(Project->GetFrameworkType(), "Kiln");

  IPtr<IOTAPersonalityServices> Personalities = PersonalityServices();
  ASSERT_TRUE(Personalities);
  EXPECT_TRUE(SameObject<IInterface>(QueryAs<IInterface>(Personalities).Get(),
                                     QueryAs<IInterface>(HalvernIDEServices).Get()));
  Host->ActiveProject = nullptr;
}

//===----------------------------------------------------------------------===//
// Package wizards
//===----------------------------------------------------------------------===//

std::vector<IPtr<IOTAWizard>>& HandedWizards() {
  static std::vector<IPtr<IOTAWizard>> Wizards;
  return Wizards;
}

TEST_F(ToolsAPIServices, RegisterPackageWizardWithoutAHookDoesNothing) {
  IPtr<TWizard> Wizard = New<TWizard>();
  RegisterPackageWizard(IPtr<IOTAWizard>(Wizard));
  EXPECT_EQ(Wizard->RefCount(), 1); // nobody kept it
}

TEST_F(ToolsAPIServices, RegisterPackageWizardForwardsToTheHook) {
  LibraryWizardProc = [](const IPtr<IOTAWizard>& Wizard) { HandedWizards().push_back(Wizard); };
  IPtr<IOTAWizard> First = New<TWizard>();
  IPtr<IOTAWizard> Second = New<TWizard>();
  RegisterPackageWizard(First);
  RegisterPackageWizard(Second);
  ASSERT_EQ(HandedWizards().size(), 2u);
  EXPECT_EQ(HandedWizards()[0], First);
  EXPECT_EQ(HandedWizards()[1], Second);
  HandedWizards().clear();
}

//===----------------------------------------------------------------------===//
// Notifier bases
//===----------------------------------------------------------------------===//

/// Counts what reaches it and notes its own end.
class TCountingModuleNotifier : public TModuleNotifierObject {
  FK_CLASS(TCountingModuleNotifier, TModuleNotifierObject)
public:
  explicit TCountingModuleNotifier(bool* Gone = nullptr) : FGone(Gone) {}
  void Modified() override { ++ModifiedCount; }
  void BeforeDestruction() override {
    if (FGone) *FGone = true;
    inherited::BeforeDestruction();
  }
  int ModifiedCount = 0;

private:
  bool* FGone;
};
FK_IMPLEMENT(TCountingModuleNotifier, "ToolsAPITest") {}

TEST(ToolsAPINotifiers, NotifierObjectAnswersAsANotifierAndDoesNothing) {
  IPtr<IOTANotifier> Notifier = New<TNotifierObject>();
  Notifier->AfterSave();
  Notifier->BeforeSave();
  Notifier->Modified();
  Notifier->Destroyed();
  EXPECT_TRUE(Supports<IInterface>(Notifier));
  EXPECT_FALSE(Supports<IOTAModuleNotifier>(Notifier));
  auto* Obj = static_cast<TNotifierObject*>(Notifier.Get());
  EXPECT_EQ(Obj->ClassName(), "TNotifierObject");
  EXPECT_EQ(Obj->UnitName(), "ToolsAPI");
}

TEST(ToolsAPINotifiers, ModuleNotifierObjectAnswersForEveryVersionWithDefaults) {
  IPtr<TModuleNotifierObject> Obj = New<TModuleNotifierObject>();
  IPtr<IOTAModuleNotifier> V1 = InterfaceOf<IOTAModuleNotifier>(Obj.Get());
  IPtr<IOTAModuleNotifier80> V80 = InterfaceOf<IOTAModuleNotifier80>(Obj.Get());
  IPtr<IOTAModuleNotifier90> V90 = InterfaceOf<IOTAModuleNotifier90>(Obj.Get());
  IPtr<IOTANotifier> Base = InterfaceOf<IOTANotifier>(Obj.Get());
  ASSERT_TRUE(V1 && V80 && V90 && Base);
  EXPECT_TRUE(SameObject<IInterface>(QueryAs<IInterface>(V1).Get(),
                                     QueryAs<IInterface>(Base).Get()));

  EXPECT_TRUE(V1->CheckOverwrite());
  V1->ModuleRenamed("Renamed.kfm");
  EXPECT_TRUE(V80->AllowSave());
  EXPECT_EQ(V80->GetOverwriteFileNameCount(), 0);
  EXPECT_EQ(V80->GetOverwriteFileName(0), "");
  EXPECT_EQ(V80->GetOverwriteFileName(7), "");
  V80->SetSaveFileName("Other.kfm");
  Base->AfterSave();
  Base->BeforeSave();
  Base->Modified();
  Base->Destroyed();
}

TEST(ToolsAPINotifiers, AnOverrideIsReachedThroughEitherNotifierBase) {
  bool Gone = false;
  {
    IPtr<TCountingModuleNotifier> Obj = New<TCountingModuleNotifier>(&Gone);
    // Reached through the module notifier's chain and through the notifier object's base.
    InterfaceOf<IOTANotifier>(Obj.Get())->Modified();
    IPtr<IOTAModuleNotifier> Module = InterfaceOf<IOTAModuleNotifier>(Obj.Get());
    static_cast<IOTANotifier*>(Module.Get())->Modified();
    static_cast<IOTANotifier*>(static_cast<TNotifierObject*>(Obj.Get()))->Modified();
    EXPECT_EQ(Obj->ModifiedCount, 3);
    EXPECT_FALSE(Gone);
  }
  EXPECT_TRUE(Gone); // died with its last reference
}

//===----------------------------------------------------------------------===//
// Files
//===----------------------------------------------------------------------===//

TEST(ToolsAPIFiles, StringToIOTAFileHasTheSourceAndNoAge) {
  IPtr<IOTAFile> File = StringToIOTAFile("object Form1: TForm1\nend\n");
  ASSERT_TRUE(File);
  EXPECT_EQ(File->GetSource(), "object Form1: TForm1\nend\n");
  EXPECT_EQ(File->GetAge(), -1);
  EXPECT_EQ(StringToIOTAFile("")->GetSource(), "");

  IPtr<IOTAFile> Dated = New<TOTAFile>("text", TDateTime(45000.5));
  EXPECT_EQ(Dated->GetSource(), "text");
  EXPECT_EQ(Dated->GetAge(), 45000.5);
}

} // namespace
