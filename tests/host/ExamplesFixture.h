//===- tests/host/ExamplesFixture.h - The formkit command on copies of the examples ===//
//
// Each test gets a scratch directory holding a copy of examples/, runs the
// formkit command there with its output and messages caught, and can compare
// every file of the directory before and after.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "host/FormkitCommand.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>

namespace formkit::hosttest {

struct ExamplesFixture : ::testing::Test {
  std::filesystem::path Dir;
  std::filesystem::path Home = std::filesystem::current_path();
  std::ostringstream Out, Err;

  void SetUp() override {
    char Template[] = "/tmp/fk-command-XXXXXX";
    ASSERT_NE(::mkdtemp(Template), nullptr);
    Dir = Template;
    for (const auto& Entry : std::filesystem::directory_iterator(FK_EXAMPLES_DIR))
      if (Entry.is_regular_file()) std::filesystem::copy_file(Entry.path(), Dir / Entry.path().filename());
  }
  void TearDown() override {
    std::error_code Ignored;
    std::filesystem::current_path(Home, Ignored);
    std::filesystem::remove_all(Dir, Ignored);
  }
  /// The path of `File` in the scratch directory.
  String At(const String& File) const { return (Dir / File).string(); }
  /// `formkit Args...`, its output in `Out` and `Err`.
  int Run(std::vector<String> Args) {
    Out.str("");
    Err.str("");
    return RunFormkit(Args, Out, Err);
  }
  static String Read(const std::filesystem::path& Path) {
    std::ifstream In(Path, std::ios::binary);
    std::ostringstream S;
    S << In.rdbuf();
    return S.str();
  }
  /// Every file of the scratch directory with its bytes.
  std::map<String, String> Files() const {
    std::map<String, String> All;
    for (const auto& Entry : std::filesystem::directory_iterator(Dir))
      All[Entry.path().filename().string()] = Read(Entry.path());
    return All;
  }
  void WriteScript(const String& Name, const String& Text) { std::ofstream(At(Name)) << Text; }
};

} // namespace formkit::hosttest
