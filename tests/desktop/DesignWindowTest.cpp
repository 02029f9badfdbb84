//===- tests/desktop/DesignWindowTest.cpp - Windows beside a designer ----===//
#include "tests/desktop/DesktopTestWindows.h"

#include "core/DesignCore.h"
#include "core/DesignNotifications.h"
#include "core/DesignIntfClasses.h"
#include "core/Designers.h"
#include "desktop/DesignWindows.h"
#include "tests/fakes/FakeDesigner.h"
#include "tests/fakes/RecordingEnvironment.h"

using namespace formkit;
using namespace formkit::desktoptest;
using namespace formkit::fakes;

namespace {

/// A design window that notes what it hears about its own designer.
class TNotingWindow : public TDesignWindow {
  FK_CLASS(TNotingWindow, TDesignWindow)
public:
  void ItemsModified(const IPtr<IDesigner>& D) override {
    Heard.push_back(D == Designer() ? "modified" : "modified elsewhere");
  }
  void DesignerClosed(const IPtr<IDesigner>& D, bool) override {
    if (D == Designer()) Heard.push_back("closed");
  }
  void Activated() override { Heard.push_back("activated"); }
  void SelectionChanged(const IPtr<IDesigner>& D, const IPtr<IDesignerSelections>& S) override {
    if (D == Designer()) Heard.push_back("selected " + std::to_string(S ? S->GetCount() : 0));
  }
  bool EditAction(TEditAction A) override {
    Heard.push_back("edit " + std::to_string(static_cast<int>(A)));
    return true;
  }
  std::vector<String> Heard;
};
FK_IMPLEMENT(TNotingWindow, "DesktopTest") {}

struct TAnyForm : TComponent {
  FK_CLASS(TAnyForm, TComponent)
};
FK_IMPLEMENT(TAnyForm, "DesktopTest") {}

class DesignWindows : public DesktopTest {
protected:
  TCallLog Log;
  IPtr<TRecordingEnvironment> Env;
  IPtr<TFakeDesigner> Framework;

  void SetUp() override {
    DesktopTest::SetUp();
    StartDesignCore();
    Env = New<TRecordingEnvironment>(&Log);
    Framework = New<TFakeDesigner>(IPtr<IDesignEnvironment>(InterfaceOf<IDesignEnvironment>(Env.Get())), ".kfm",
                                   TAnyForm::StaticClass());
    Designers()->RegisterDesigner(InterfaceOf<IComponentDesigner>(Framework.Get()));
  }
  void TearDown() override {
    Designers()->UnregisterDesigner(InterfaceOf<IComponentDesigner>(Framework.Get()));
    Framework = nullptr;
    Env = nullptr;
    DesktopTest::TearDown();
    StopDesignCore();
  }
};

TEST_F(DesignWindows, ServesOneDesignerAndHearsAll) {
  auto Root = Framework->AddRoot("Form1", &Log);
  auto Other = Framework->AddRoot("Form2", &Log);
  IPtr<IDesigner> Mine = Root->GetDesigner();
  auto* W = CreateComponentOf<TNotingWindow>(Application());
  Vars["W"] = W;
  W->SetBounds(0, 0, 300, 200);
  W->SetDesigner(Mine);
  EXPECT_EQ(W->ComponentDesigner(), InterfaceOf<IComponentDesigner>(Framework.Get())) << "found by its extension";
  EXPECT_EQ(W->BoundsRect(), Bounds(200, 122, 300, 200)) << "below the host's main window";
  W->SetBounds(10, 10, 300, 200);
  W->SetDesigner(Mine);
  EXPECT_EQ(W->Left(), 10) << "the same designer again changes nothing";

  DesignNotificationItemsModified(Mine);
  DesignNotificationItemsModified(Other->GetDesigner());
  EXPECT_EQ(W->Heard, (std::vector<String>{"modified", "modified elsewhere"}));
  TComponent* Thing = CreateComponentOf<TAnyForm>(Root->RootComponent());
  EXPECT_EQ(W->UniqueName(Thing), "TAnyForm1");

  // A selection made here goes through the framework's designer, which then hands its
  // edits to this window.
  auto Selection = New<TDesignerSelections>();
  Selection->Add(Thing);
  W->SetSelection(IPtr<IDesignerSelections>(Selection.Get()));
  EXPECT_EQ(W->Heard.back(), "selected 1");
  auto Current = New<TDesignerSelections>();
  Framework->GetSelection(IPtr<IDesignerSelections>(Current.Get()));
  ASSERT_EQ(Current->GetCount(), 1);
  EXPECT_EQ(Current->Get(0), Thing);
  EXPECT_TRUE(Framework->EditAction(eaCopy));
  EXPECT_EQ(W->Heard.back(), "edit " + std::to_string(static_cast<int>(eaCopy)));

  // Hidden with its module and back in its state; `Visible` stays throughout.
  W->Show();
  W->SetWindowState(wsMaximized);
  W->WindowHide();
  EXPECT_TRUE(W->Visible());
  EXPECT_FALSE(IsWindowVisible(W));
  W->WindowShow();
  EXPECT_TRUE(IsWindowVisible(W));
  EXPECT_EQ(W->WindowState(), wsMaximized);

  // Activation.
  auto* Else = MakeWindow<TPaneWindow>("Else");
  Else->Show();
  W->Activate();
  EXPECT_TRUE(W->Active());
  Else->Activate();
  EXPECT_FALSE(W->Active());
  EXPECT_EQ(W->Heard.back(), "activated");

  // A window that goes hears nothing more.
  W->Destroy();
  Vars["W"] = nullptr;
  DesignNotificationItemsModified(Mine);
  Root = nullptr;
  Other = nullptr;
}

} // namespace
