//===- tests/frameworks/kiln/design/KilnDesignFixture.h - A Kiln designer at work ===//
//
// Starts the design core with the Kiln designer package and a recording host,
// and opens new form modules on it. A tool is armed as the host's palette does.
// Each module's root gets a generated class of its own (named after the module,
// "TForm1") from the generated classes the package installs, so handlers are
// methods of the designed class, and the class goes with the root.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignCore.h"
#include "core/Designers.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "inheritance/Proxies.h"
#include "inheritance/UpdateManager.h"
#include "tests/fakes/RecordingEnvironment.h"
#include "tests/fakes/RecordingModule.h"
#include "tests/frameworks/kiln/design/ClassFamily.h"

#include <gtest/gtest.h>

namespace formkit::fakes {

/// A palette entry the host offers: it makes its class and says whether it is usable.
class TToolItem : public TClassPaletteItem, public IOTABasePaletteItem {
  FK_CLASS(TToolItem, TClassPaletteItem)
  FK_INTERFACES(IOTABasePaletteItem)
  explicit TToolItem(TClass Class = nullptr) : TClassPaletteItem(Class), FClass(Class) {}
  String GetIDString() override { return FClass ? FClass->ClassName : ""; }
  bool GetEnabled() override { return Enabled; }
  bool Enabled = true;

private:
  TClass FClass;
};

/// A module's form as component data in text: signature and tree, written against
/// `Ancestor` when given.
String FormImage(TComponent* Root, TComponent* Ancestor = nullptr);

struct KilnDesignFixture : ::testing::Test {
  TCallLog Log;
  IPtr<TRecordingEnvironment> Env;
  IPtr<IComponentDesigner> Designer;
  std::vector<IPtr<IRoot>> Open;

  void SetUp() override {
    StartDesignCore();
    RegisterKilnDesignPackage();
    Env = New<TRecordingEnvironment>(&Log);
    InitializeDesigners(InterfaceOf<IDesignEnvironment>(Env.Get()));
    Designer = Designers()->DesignerFromExtension(".kfm");
    ASSERT_TRUE(Designer);
  }
  void TearDown() override {
    // Last opened, first closed: a module that nests another goes before the one it nests.
    for (auto R = Open.rbegin(); R != Open.rend(); ++R)
      if ((*R)->GetRoot() || QueryAs<IInternalRoot>(*R)->IsDormant()) (*R)->Close();
    Open.clear();
    EXPECT_EQ(ProxyClassCount(), 0) << "a closed module's class outlived it";
    if (Designer) Designers()->UnregisterDesigner(Designer);
    Designer = nullptr;
    GetPPIForKilnDesignerForIItemFunc = nullptr;
    StopDesignCore();
    FinalizeKiln();
    RemoveUpdateManagerHooks(); // what the package set, so that the next test starts bare
    RemoveClassProxyHooks();
  }

  /// A new form module "Name" with a recording module record.
  IPtr<IRoot> NewForm(const String& Name, IPtr<TRecordingModule>* ModuleOut = nullptr) {
    return OpenModule(Name, "", ModuleOut);
  }
  /// A new module "Name" inheriting from the open module "AncestorName".
  IPtr<IRoot> NewDescendant(const String& Name, const String& AncestorName) { return OpenModule(Name, AncestorName); }
  IPtr<IRoot> OpenModule(const String& Name, const String& AncestorName, IPtr<TRecordingModule>* ModuleOut = nullptr) {
    IPtr<TRecordingModule> Module = New<TRecordingModule>(Name + ".kfm", &Log);
    if (ModuleOut) *ModuleOut = Module;
    IPtr<IRoot> Root = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), Name + ".kfm", false, Name,
                                            AncestorName, "", nullptr, "");
    Open.push_back(Root);
    return Root;
  }
  static TKilnRoot* KilnRoot(const IPtr<IRoot>& Root) {
    return dynamic_cast<TKilnRoot*>(QueryAs<IInternalRoot>(Root)->Implementor());
  }
  /// Arms the palette with a tool of `Class`; null disarms.
  void Arm(TClass Class) {
    Env->ToolSelected = Class ? InterfaceOf<IOTABasePaletteItem>(New<TToolItem>(Class).Get()) : nullptr;
  }
  /// A drag with the mouse from one point to another, in surface coordinates.
  static void Drag(TKilnSurface* S, TPoint From, TPoint To, TShiftState Shift = {}) {
    S->MouseDown(From.X, From.Y, Shift);
    S->MouseMove(To.X, To.Y);
    S->MouseUp(To.X, To.Y);
  }
};

} // namespace formkit::fakes
