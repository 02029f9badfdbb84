//===- tests/tools/StringsFileSystemTest.cpp - The strings file system alone ===//
//
// What the strings file system does without designed modules: its file names
// and dates, its registration with the host's module services, its answers
// as a virtual file system, and the message of a name that resolves to
// nothing. Reading and writing the properties of designed modules is tested
// with the Kiln designer (tests/frameworks/kiln/design).
//
//===----------------------------------------------------------------------===//
#include "tools/StringsFileSystem.h"

#include <gtest/gtest.h>

#include <vector>

using namespace formkit;

namespace {

/// Module services that keep the file systems registered with them.
class TFileSystemRegistrar : public TInterfacedObject, public IHalvernIDEServices, public IOTAModuleServices {
  FK_CLASS(TFileSystemRegistrar, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTAModuleServices)

  std::vector<IPtr<IOTAFileSystem>> FileSystems;
  std::vector<String> Calls;
  /// What `AddFileSystem` answers when negative: the host refuses.
  int Refusal = 0;

  int AddFileSystem(const IPtr<IOTAFileSystem>& FileSystem) override {
    Calls.push_back("Add " + FileSystem->GetIDString());
    if (Refusal < 0) return Refusal;
    FileSystems.push_back(FileSystem);
    return static_cast<int>(FileSystems.size()) - 1;
  }
  void RemoveFileSystem(int Index) override {
    Calls.push_back("Remove " + IntToStr(Index));
    FileSystems.at(static_cast<size_t>(Index)) = nullptr;
  }
  IPtr<IOTAModule> CreateModule(const IPtr<IOTACreator>&) override { return nullptr; }
  IPtr<IOTAModule> FindModule(const String&) override { return nullptr; }
  int GetModuleCount() override { return 0; }
  IPtr<IOTAModule> GetModule(int) override { return nullptr; }
  IPtr<IOTAProjectGroup> GetMainProjectGroup() override { return nullptr; }
  IPtr<IOTAProject> GetActiveProject() override { return nullptr; }
};
FK_IMPLEMENT(TFileSystemRegistrar, "StringsFileSystemTest") {}

struct StringsFileSystemAlone : ::testing::Test {
  IPtr<TFileSystemRegistrar> Host = New<TFileSystemRegistrar>();

  void TearDown() override {
    HalvernIDEServices = IPtr<IHalvernIDEServices>(Host.Get());
    UnregisterStringsFileSystem();
    HalvernIDEServices = nullptr;
  }
  void Arrive() { HalvernIDEServices = IPtr<IHalvernIDEServices>(Host.Get()); }
};

TEST_F(StringsFileSystemAlone, FileNamesHaveFourPartsTheLastTakingTheRest) {
  EXPECT_EQ(MakeStringsFileName("Kiln", "Form1", "Memo1", "Lines"), "Kiln.Form1.Memo1.Lines");
  TStringsFileName Parts = SplitStringsFileName("/a.b/Kiln.Form1.Memo1.Lines.More");
  EXPECT_EQ(Parts.Designer + "|" + Parts.Root + "|" + Parts.Component + "|" + Parts.Property,
            "Kiln|Form1|Memo1|Lines.More");
  Parts = SplitStringsFileName("Kiln.Form1");
  EXPECT_EQ(Parts.Designer + "|" + Parts.Root + "|" + Parts.Component + "|" + Parts.Property, "Kiln|Form1||");
}

TEST_F(StringsFileSystemAlone, DatesArePackedAsFileDates) {
  // 2026-11-23 13:45:58: years from 1980, seconds halved.
  EXPECT_EQ(DateTimeToFileDate(EncodeDate(2026, 11, 23) + EncodeTime(13, 45, 58, 0)),
            static_cast<int>((46u << 9 | 11u << 5 | 23u) << 16 | (13u << 11 | 45u << 5 | 29u)));
  EXPECT_EQ(DateTimeToFileDate(EncodeDate(1980, 1, 1)), static_cast<int>((1u << 5 | 1u) << 16));
  EXPECT_EQ(DateTimeToFileDate(EncodeDate(1979, 12, 31) + EncodeTime(23, 59, 59, 0)), 0);
  // Later times of a day give larger values.
  EXPECT_LT(DateTimeToFileDate(EncodeDate(2026, 1, 2)), DateTimeToFileDate(EncodeDate(2026, 1, 2) + 0.5));
}

TEST_F(StringsFileSystemAlone, RegistersOnceWithTheHostsModuleServices) {
  RegisterStringsFileSystem(); // no host yet
  EXPECT_EQ(StringsFileSystem(), nullptr);
  EXPECT_TRUE(Host->Calls.empty());

  Arrive();
  RegisterStringsFileSystem();
  RegisterStringsFileSystem();
  ASSERT_TRUE(StringsFileSystem());
  EXPECT_EQ(Host->Calls, std::vector<String>{"Add Tessel.TStringsFileSystem"});
  EXPECT_EQ(Host->FileSystems.at(0), QueryAs<IOTAFileSystem>(StringsFileSystem()));

  UnregisterStringsFileSystem();
  UnregisterStringsFileSystem();
  EXPECT_EQ(StringsFileSystem(), nullptr);
  EXPECT_EQ(Host->Calls, (std::vector<String>{"Add Tessel.TStringsFileSystem", "Remove 0"}));

  // A host that refuses keeps nothing, and nothing is removed later.
  Host->Refusal = -1;
  RegisterStringsFileSystem();
  EXPECT_EQ(StringsFileSystem(), nullptr);
  UnregisterStringsFileSystem();
  EXPECT_EQ(Host->Calls.back(), "Add Tessel.TStringsFileSystem");
}

TEST_F(StringsFileSystemAlone, AnswersAsAVirtualFileSystem) {
  Arrive();
  RegisterStringsFileSystem();
  IPtr<IOTAFileSystem> Files = Host->FileSystems.at(0);
  const String Name = "Kiln.Form1.Memo1.Lines";
  EXPECT_EQ(Files->GetIDString(), "Tessel.TStringsFileSystem");
  EXPECT_FALSE(Files->IsFileBased());
  EXPECT_FALSE(Files->IsReadonly(Name));
  EXPECT_TRUE(Files->RenameFile(Name, "Kiln.Form1.Memo2.Lines"));
  EXPECT_TRUE(Files->DeleteFile(Name));
  EXPECT_EQ(Files->GetTempFileName(Name), Name);
  EXPECT_EQ(Files->GetBackupFileName(Name), Name);
  EXPECT_EQ(Files->FileAge(Name), -1);
  // Without designers nothing resolves.
  EXPECT_FALSE(Files->FileExists(Name));
  try {
    (void)Files->GetFileStream("/some/dir/" + Name, fmOpenRead | fmShareDenyNone);
    ADD_FAILURE() << "no error";
  } catch (const ENonAIRException& E) {
    EXPECT_EQ(E.Message(), "Unable to locate form/component, 'Kiln.Form1.Memo1.Lines'");
  }
  EXPECT_EQ(StringsFileSystem()->Count(), 0);
}

} // namespace
