//===- tests/platform/RegistryTest.cpp - The settings registry -----------===//
#include "platform/Registry.h"

#include "platform/Streams.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <unistd.h>

using namespace formkit;

namespace {

/// A file name in the temporary folder that no other test uses; removed at the end.
struct TempFile {
  String Name = Format("/tmp/formkit-registry-%d-%d", static_cast<int>(::getpid()), Counter++);
  ~TempFile() { std::remove(Name.c_str()); }
  static inline int Counter = 0;
};

template <class F> String RegistryErrorOf(F&& Fn) {
  try {
    Fn();
  } catch (const ERegistryException& E) {
    return E.Message();
  }
  return "(nothing raised)";
}

std::vector<String> Lines(TStrings* S) {
  std::vector<String> Result;
  for (int I = 0; I < S->Count(); ++I) Result.push_back(S->Get(I));
  return Result;
}

TEST(RegistryTest, KeysHoldNamedTextsAndNumbersFoundWithoutRegardToCase) {
  TRegistryStore Store;
  TRegistry Reg(Store);
  EXPECT_FALSE(Reg.OpenKey("Software\\Formkit", false)) << "nothing exists yet";
  EXPECT_FALSE(Reg.HasKeyOpen());
  ASSERT_TRUE(Reg.OpenKey("Software\\Formkit", true));
  EXPECT_EQ(Reg.CurrentPath(), "Software\\Formkit");
  Reg.WriteString("Title", "Main");
  Reg.WriteInteger("Left", -120);
  Reg.WriteBool("Visible", true);
  EXPECT_EQ(Reg.ReadString("TITLE"), "Main");
  EXPECT_EQ(Reg.ReadInteger("left"), -120);
  EXPECT_TRUE(Reg.ReadBool("Visible"));
  EXPECT_EQ(Reg.GetDataType("Title"), rdString);
  EXPECT_EQ(Reg.GetDataType("Left"), rdInteger);
  EXPECT_EQ(Reg.GetDataType("Top"), rdUnknown);
  EXPECT_EQ(Reg.ReadString("Top"), "") << "a missing text reads empty";
  Reg.WriteString("left", "now text"); // a write replaces the value whatever its kind
  EXPECT_EQ(Reg.GetDataType("Left"), rdString);

  // Relative and absolute paths; the keys and values keep their order of creation.
  ASSERT_TRUE(Reg.OpenKey("Windows\\Inspector", true));
  EXPECT_EQ(Reg.CurrentPath(), "Software\\Formkit\\Windows\\Inspector");
  ASSERT_TRUE(Reg.OpenKey("\\software\\FORMKIT", false));
  TStringList Names;
  Reg.GetValueNames(&Names);
  EXPECT_EQ(Lines(&Names), (std::vector<String>{"Title", "Left", "Visible"}));
  Reg.GetKeyNames(&Names);
  EXPECT_EQ(Lines(&Names), (std::vector<String>{"Windows"}));
  EXPECT_TRUE(Reg.HasSubKeys());
  EXPECT_TRUE(Reg.KeyExists("Windows\\inspector"));
  EXPECT_TRUE(Reg.KeyExists("\\Software"));

  // Paths with an empty part or a line break are refused, and the open key stays.
  EXPECT_FALSE(Reg.OpenKey("a\\\\b", true));
  EXPECT_FALSE(Reg.OpenKey("a\nb", true));
  EXPECT_FALSE(Reg.CreateKey("trailing\\"));
  EXPECT_EQ(Reg.CurrentPath(), "Software\\Formkit");
  EXPECT_TRUE(Reg.DeleteValue("Visible"));
  EXPECT_FALSE(Reg.DeleteValue("Visible"));
  EXPECT_FALSE(Reg.ValueExists("visible"));
}

TEST(RegistryTest, ReadsOfTheWrongKindOrOfNothingAndWritesWithoutAKeyRaise) {
  TRegistryStore Store;
  TRegistry Reg(Store);
  EXPECT_EQ(RegistryErrorOf([&] { Reg.WriteString("Left", "1"); }), "No registry key is open to hold 'Left'");
  ASSERT_TRUE(Reg.OpenKey("Settings", true));
  Reg.WriteString("Name", "x");
  Reg.WriteInteger("Count", 3);
  EXPECT_EQ(RegistryErrorOf([&] { (void)Reg.ReadInteger("Width"); }), "Failed to get data for 'Width'");
  EXPECT_EQ(RegistryErrorOf([&] { (void)Reg.ReadInteger("Name"); }), "Invalid data type for 'Name'");
  EXPECT_EQ(RegistryErrorOf([&] { (void)Reg.ReadString("Count"); }), "Invalid data type for 'Count'");
  Reg.CloseKey();

  ASSERT_TRUE(Reg.OpenKeyReadOnly("Settings"));
  EXPECT_EQ(RegistryErrorOf([&] { Reg.WriteInteger("Count", 4); }), "No registry key is open to hold 'Count'");
  EXPECT_FALSE(Reg.DeleteValue("Count"));
  EXPECT_EQ(Reg.ReadInteger("Count"), 3) << "a refused write changes nothing";
  EXPECT_FALSE(Reg.OpenKeyReadOnly("Missing"));
}

TEST(RegistryTest, ADeletedKeyTakesItsSubtreeAndIsGoneForEveryCursor) {
  TRegistryStore Store;
  TRegistry Writer(Store), Reader(Store);
  ASSERT_TRUE(Writer.OpenKey("A\\B\\C", true));
  Writer.WriteInteger("Deep", 1);
  ASSERT_TRUE(Reader.OpenKey("A\\B\\C", false));
  EXPECT_EQ(Reader.ReadInteger("Deep"), 1);

  Writer.CloseKey();
  EXPECT_TRUE(Writer.DeleteKey("A\\b"));
  EXPECT_FALSE(Writer.DeleteKey("A\\B"));
  EXPECT_FALSE(Writer.KeyExists("A\\B\\C"));
  EXPECT_TRUE(Writer.KeyExists("A"));
  EXPECT_FALSE(Reader.ValueExists("Deep"));
  EXPECT_EQ(RegistryErrorOf([&] { (void)Reader.ReadInteger("Deep"); }), "Failed to get data for 'Deep'");
  Reader.WriteInteger("Again", 2); // a write makes the open key again
  EXPECT_TRUE(Writer.KeyExists("A\\B\\C"));
}

TEST(RegistryTest, TheStoreIsKeptInItsFileAndReadBackWhole) {
  TempFile File;
  {
    TRegistryStore Store;
    Store.SetFileName(File.Name); // missing: the tree stays, the first flush makes the file
    TRegistry Reg(Store);
    ASSERT_TRUE(Reg.OpenKey("Software\\Formkit\\Odd", true));
    Reg.WriteString("a=b\\c", "line one\nline=two\\");
    Reg.WriteInteger("Count", -7);
    Reg.CloseKey(); // flushes
    EXPECT_FALSE(Store.Modified());
    EXPECT_EQ(Store.SaveToText(), "[Software\\Formkit\\Odd]\n"
                                  "s:a\\eb\\\\c=line one\\nline\\etwo\\\\\n"
                                  "i:Count=-7\n");
  }
  TRegistryStore Again;
  Again.SetFileName(File.Name);
  EXPECT_FALSE(Again.Modified());
  TRegistry Reg(Again);
  ASSERT_TRUE(Reg.OpenKeyReadOnly("Software\\Formkit\\Odd"));
  EXPECT_EQ(Reg.ReadString("A=B\\C"), "line one\nline=two\\");
  EXPECT_EQ(Reg.ReadInteger("Count"), -7);
  Reg.CloseKey();
  EXPECT_FALSE(Again.Modified()) << "reading changes nothing";

  // A file that cannot be written: the write fails, and the tree stays marked changed.
  TRegistryStore Homeless;
  Homeless.SetFileName("/formkit-no-such-folder/registry");
  TRegistry Writer(Homeless);
  ASSERT_TRUE(Writer.OpenKey("Key", true));
  Writer.WriteInteger("Value", 1);
  EXPECT_THROW(Writer.CloseKey(), EFCreateError);
  EXPECT_TRUE(Homeless.Modified());
  EXPECT_FALSE(Writer.HasKeyOpen());
}

TEST(RegistryTest, ADamagedFileIsRefusedAndTheStoreKeepsItsTreeAndFile) {
  TempFile Good, Bad;
  TRegistryStore Store;
  Store.SetFileName(Good.Name);
  TRegistry Reg(Store);
  ASSERT_TRUE(Reg.OpenKey("Kept", true));
  Reg.WriteInteger("Value", 1);
  Reg.CloseKey();
  const std::pair<const char*, int> Damages[] = {
      {"[Key]\nx:Name=1\n", 2}, {"[Key]\ni:Name=one\n", 2}, {"Name=1\n", 1},
      {"[Key]\ns:Name\n", 2},   {"[a\\\\b]\n", 1},     {"[Key]\ns:Bad\\qEscape=1\n", 2}};
  for (const auto& [Damage, Line] : Damages) {
    WriteFileText(Bad.Name, Damage);
    String Expected = Format("Registry file \"%s\" is damaged at line %d", Bad.Name, Line);
    EXPECT_EQ(RegistryErrorOf([&] { Store.SetFileName(Bad.Name); }), Expected) << Damage;
    EXPECT_EQ(Store.FileName(), Good.Name);
    EXPECT_EQ(Store.SaveToText(), "[Kept]\ni:Value=1\n");
  }
}

TEST(RegistryTest, AKeySeenAsAKeyFileHasItsSubkeysForSections) {
  TRegistryStore Store;
  TObjectGuard<TRegistryIniFile> Ini(new TRegistryIniFile("\\Software\\Formkit", Store));
  EXPECT_EQ(Ini->FileName(), "Software\\Formkit");
  EXPECT_EQ(Ini->ReadString("Colors", "ColorA", "none"), "none");
  Ini->WriteString("Colors", "ColorA", "FFFFFF");
  Ini->WriteString("Colors", "ColorB", "000080");
  Ini->WriteInteger("Window", "Left", 12);
  TStringList List;
  Ini->ReadSections(&List);
  EXPECT_EQ(Lines(&List), (std::vector<String>{"Colors", "Window"}));
  Ini->ReadSection("colors", &List);
  EXPECT_EQ(Lines(&List), (std::vector<String>{"ColorA", "ColorB"}));
  EXPECT_EQ(Ini->ReadInteger("Window", "Left", 0), 12);
  EXPECT_TRUE(Ini->ValueExists("Colors", "colorb"));
  Ini->DeleteKey("Colors", "ColorB");
  EXPECT_FALSE(Ini->ValueExists("Colors", "ColorB"));
  Ini->EraseSection("Window");
  EXPECT_FALSE(Ini->SectionExists("Window"));

  // An integer value written through a cursor reads as its text.
  TRegistry Reg(Store);
  ASSERT_TRUE(Reg.OpenKey("\\Software\\Formkit\\Colors", false));
  Reg.WriteInteger("Count", 2);
  EXPECT_EQ(Ini->ReadString("Colors", "Count", ""), "2");
}

} // namespace
