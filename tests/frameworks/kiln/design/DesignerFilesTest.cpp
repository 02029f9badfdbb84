//===- tests/frameworks/kiln/design/DesignerFilesTest.cpp - The designer's files ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include <filesystem>

using namespace formkit;
using namespace formkit::fakes;

TEST_F(KilnDesignFixture, TheDesignersFileOperationsWorkOnRealFiles) {
  auto Files = QueryAs<IInternalComponentDesigner>(Designer);
  namespace fs = std::filesystem;
  fs::path Dir = fs::temp_directory_path() / ("formkit-files-" + std::to_string(::getpid()));
  fs::create_directories(Dir);
  String Name = (Dir / "Unit1.kfm").string();

  EXPECT_FALSE(Files->FileExists("", Name));
  EXPECT_EQ(Files->GetFileAge("", Name), -1);
  {
    TObjectGuard<TStream> Out(Files->OpenFile("", Name, fmCreate));
    Out->WriteBuffer("KDS1", 4);
  }
  EXPECT_TRUE(Files->FileExists("", Name));
  EXPECT_GT(Files->GetFileAge("", Name), 0);
  EXPECT_FALSE(Files->IsFileReadOnly("", Name));
  {
    TObjectGuard<TStream> In(Files->OpenFile("", Name, fmOpenRead | fmShareDenyNone));
    char Buf[4] = {};
    In->ReadBuffer(Buf, 4);
    EXPECT_EQ(String(Buf, 4), "KDS1");
  }
  String Temp, Backup;
  Files->GetTempFileName("", Name, Temp);
  Files->GetBackupFileName("", Name, Backup);
  EXPECT_EQ(Temp, (Dir / "Unit1.$$$").string());
  EXPECT_EQ(Backup, (Dir / "Unit1.~kfm").string());
  EXPECT_TRUE(Files->RenameFile("", Name, Backup));
  EXPECT_FALSE(Files->FileExists("", Name));
  EXPECT_TRUE(Files->DeleteFile("", Backup));
  EXPECT_FALSE(Files->DeleteFile("", Backup));
  EXPECT_THROW(Files->OpenFile("", Name, fmOpenRead), EFOpenError);
  fs::remove_all(Dir);

  // Which roots the designer serves.
  EXPECT_TRUE(Files->SupportsRootClass(TForm::StaticClass()));
  EXPECT_TRUE(Files->SupportsRootClass(TDataModule::StaticClass()));
  EXPECT_FALSE(Files->SupportsRootClass(TComponent::StaticClass()));
  EXPECT_EQ(Designer->GetDataModuleClass(), TDataModule::StaticClass());
}
