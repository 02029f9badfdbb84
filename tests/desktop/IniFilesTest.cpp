//===- tests/desktop/IniFilesTest.cpp - Key files in memory and on disk --===//
#include "tests/desktop/DesktopTestSupport.h"


using namespace formkit;
using namespace formkit::desktoptest;

namespace {

void Spit(const String& FileName, const String& Text) {
  std::ofstream Out(FileName, std::ios::binary);
  Out << Text;
}

TEST(IniFiles, ValuesReadLenientlyAndWriteInFileOrder) {
  TObjectGuard<TMemIniFile> Ini(new TMemIniFile);
  Ini->SetText("; a comment\r\nstray=before any section\r\n[Window]\r\nLeft=120\r\nTop = $20\r\n"
               "Width=12px\r\nFlag\r\n[Other]\r\nVisible=1\r\n[window]\r\nHeight=-40\r\n");
  EXPECT_EQ(Ini->ReadInteger("Window", "Left", 0), 120);
  EXPECT_EQ(Ini->ReadInteger("WINDOW", "top", 0), 32) << "names without regard to case, hexadecimal values";
  EXPECT_EQ(Ini->ReadInteger("Window", "Width", 7), 7) << "a bad number gives the default";
  EXPECT_EQ(Ini->ReadInteger("Window", "Height", 0), -40) << "a repeated header continues its section";
  EXPECT_TRUE(Ini->ValueExists("Window", "Flag"));
  EXPECT_EQ(Ini->ReadString("Window", "Flag", "x"), "");
  EXPECT_FALSE(Ini->ValueExists("Window", "stray"));
  EXPECT_TRUE(Ini->ReadBool("Other", "Visible", false));
  EXPECT_TRUE(Ini->ReadBool("Other", "Missing", true));
  EXPECT_FALSE(Ini->SectionExists("Nowhere"));

  Ini->WriteBool("Other", "Visible", false);
  Ini->WriteInteger("New", "Count", 3);
  Ini->DeleteKey("Window", "Flag");
  EXPECT_EQ(Ini->Text(), "[Window]\nLeft=120\nTop= $20\nWidth=12px\nHeight=-40\n\n"
                         "[Other]\nVisible=0\n\n[New]\nCount=3\n\n");
  Ini->EraseSection("other");
  TObjectGuard<TStringList> Names(new TStringList);
  Ini->ReadSections(Names.Get());
  EXPECT_EQ(Names->CommaText(), "Window,New");
  Ini->ReadSection("Window", Names.Get());
  EXPECT_EQ(Names->CommaText(), "Left,Top,Width,Height");
}

TEST(IniFiles, FilesThatCannotBeReadOrWrittenLeaveEverythingAsItWas) {
  TTempDir Dir;
  String Name = Dir.File("settings.ini");
  {
    TObjectGuard<TMemIniFile> Fresh(new TMemIniFile(Name));
    EXPECT_FALSE(Fresh->SectionExists("A")) << "a missing file starts empty";
    Fresh->WriteString("A", "Key", "Value");
    Fresh->UpdateFile();
  }
  EXPECT_EQ(Slurp(Name), "[A]\nKey=Value\n\n");

  TObjectGuard<TMemIniFile> Ini(new TMemIniFile(Name));
  EXPECT_EQ(Ini->ReadString("A", "Key", ""), "Value");
  // A target in a directory that does not exist: the contents and the old file stay.
  Ini->WriteString("A", "Key", "Changed");
  String Missing = Dir.File("no/such/dir/settings.ini");
  Ini->Rename(Missing, false);
  try {
    Ini->UpdateFile();
    FAIL() << "a file that cannot be written raises";
  } catch (const EFCreateError& E) {
    EXPECT_EQ(String(E.what()).rfind("Cannot create file \"" + Missing + "\". ", 0), 0u) << E.what();
  }
  EXPECT_EQ(Ini->ReadString("A", "Key", ""), "Changed");
  EXPECT_EQ(Slurp(Name), "[A]\nKey=Value\n\n");

  // A name that exists but cannot be read (a directory): the contents and the name stay.
  try {
    Ini->Rename(Dir.Path(), true);
    FAIL() << "a file that cannot be read raises";
  } catch (const EFOpenError& E) {
    EXPECT_EQ(String(E.what()).rfind("Cannot open file \"" + Dir.Path() + "\". ", 0), 0u) << E.what();
  }
  EXPECT_EQ(Ini->FileName(), Missing);
  EXPECT_EQ(Ini->ReadString("A", "Key", ""), "Changed");
  EXPECT_THROW(TMemIniFile Bad(Dir.Path()), EFOpenError);

  // Rename with a reload takes the other file's contents; the write goes to it whole.
  Spit(Dir.File("other.ini"), "[B]\r\nX=1\r\n");
  Ini->Rename(Dir.File("other.ini"), true);
  EXPECT_FALSE(Ini->SectionExists("A"));
  EXPECT_EQ(Ini->ReadInteger("B", "X", 0), 1);
  Ini->UpdateFile();
  EXPECT_EQ(Slurp(Dir.File("other.ini")), "[B]\nX=1\n\n");
  EXPECT_FALSE(std::filesystem::exists(Dir.File("other.ini.tmp")));
}

} // namespace
