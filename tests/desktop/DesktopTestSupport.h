//===- tests/desktop/DesktopTestSupport.h - Shared desktop fixtures ------===//
#pragma once

#include "desktop/DeskForm.h"
#include "frameworks/kiln/Kiln.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>

namespace formkit::desktoptest {

/// A scratch directory that goes with the test.
class TTempDir {
public:
  TTempDir() {
    String Pattern = (std::filesystem::temp_directory_path() / "fk_desktop_XXXXXX").string();
    FPath = ::mkdtemp(Pattern.data()) ? Pattern : String();
  }
  ~TTempDir() {
    std::error_code Ignored;
    if (!FPath.empty()) std::filesystem::remove_all(FPath, Ignored);
  }
  TTempDir(const TTempDir&) = delete;
  TTempDir& operator=(const TTempDir&) = delete;
  String File(const String& Name) const { return FPath + "/" + Name; }
  const String& Path() const noexcept { return FPath; }

private:
  String FPath;
};

/// The whole content of a file, or empty when there is none.
inline String Slurp(const String& FileName) {
  std::ifstream In(FileName, std::ios::binary);
  return String(std::istreambuf_iterator<char>(In), std::istreambuf_iterator<char>());
}

/// A desktop in memory from its text, naming `FileName` as its file.
inline TObjectGuard<TMemIniFile> DesktopOf(const String& Text, const String& FileName = String()) {
  TObjectGuard<TMemIniFile> D(new TMemIniFile(FileName));
  D->SetText(Text);
  return D;
}

/// The form's top-left corner lies on a monitor, and its right and bottom edges do not
/// pass that monitor's.
inline void ExpectOnAMonitor(TCustomForm* F, const String& What) {
  TRect R = F->BoundsRect();
  TMonitor* M = Screen()->MonitorFromPoint(R.TopLeft(), mdNull);
  ASSERT_NE(M, nullptr) << What << " at " << R.Left << "," << R.Top << " is off every monitor";
  EXPECT_LE(R.Right, M->BoundsRect().Right) << What;
  EXPECT_LE(R.Bottom, M->BoundsRect().Bottom) << What;
}

/// The framework and the desktop started, one monitor of 1920 by 1080 with a work area
/// of 1920 by 1040, the host's variables as a map, and a list of the windows a load found.
class DesktopTest : public ::testing::Test {
protected:
  std::map<String, TCustomForm*> Vars;
  TObjectGuard<TStringList> Loaded{new TStringList};
  TTempDir Temp;

  void SetUp() override {
    InitializeKiln();
    InitializeDesktop();
    Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true}});
    GetFieldAddress = [this](const String& Name) -> TCustomForm** {
      auto It = Vars.find(Name);
      return It == Vars.end() ? nullptr : &It->second;
    };
    LoadedDesktopFormInstances = Loaded.Get();
  }

  void TearDown() override {
    // A window may have gone with its parent: only those the screen still knows.
    for (auto& Entry : Vars)
      if (TCustomForm* F = Entry.second; F && Exists(F)) F->Destroy();
    for (TClass C : Registered) UnregisterDesktopFormClass(C);
    GetFieldAddress = nullptr;
    LoadedDesktopFormInstances = nullptr;
    DesktopCommandLine.clear();
    TDesktopForm::SetForceUpdateBounds(false);
    DialogScript().Clear();
    while (TIDEDesktopService::IsDrawingLocked()) TIDEDesktopService::UnLockDrawing();
    ProcessMessages();
    FinalizeDesktop();
    FinalizeKiln();
  }

  /// Registers `C` for `Section` under the instance name `Section` and forgets it after the test.
  void Register(TClass C, const String& Section) {
    RegisterDesktopFormClass(C, Section, Section);
    Registered.push_back(C);
    Vars.try_emplace(Section, nullptr);
  }

  /// A window of `T` held in the host's variable `Section`, owned by the application.
  template <class T> T* MakeWindow(const String& Section) {
    auto* F = CreateComponentOf<T>(Application());
    F->SetDeskSection(Section);
    Vars[Section] = F;
    return F;
  }

  static bool Exists(const TCustomForm* F) {
    for (int I = 0; I < Screen()->FormCount(); ++I)
      if (Screen()->Forms(I) == F) return true;
    return false;
  }

private:
  std::vector<TClass> Registered;
};

} // namespace formkit::desktoptest
