//===- tests/frameworks/kiln/FormsTest.cpp - Forms, screen and monitors ---===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

using KilnForms = KilnTest;

TEST_F(KilnForms, FormsShowHideAndTellTheScreen) {
  struct TSink : TObject {
    std::vector<String> Log;
    void Shown(TObject*) { Log.push_back("show"); }
    void Hidden(TObject*) { Log.push_back("hide"); }
  } Sink;
  int Before = Screen()->FormCount();
  TRootGuard<TForm> A(CreateComponentOf<TForm>(nullptr));
  TRootGuard<TForm> B(CreateComponentOf<TForm>(nullptr));
  EXPECT_EQ(Screen()->FormCount(), Before + 2);
  EXPECT_EQ(Screen()->Forms(Before + 1), B.P);
  EXPECT_FALSE(A->Visible()) << "a form starts hidden";
  A->OnShow = TNotifyEvent::Bind<&TSink::Shown>(&Sink);
  A->OnHide = TNotifyEvent::Bind<&TSink::Hidden>(&Sink);
  A->Show();
  B->Show();
  EXPECT_EQ(Screen()->ActiveForm(), B.P);
  B->Close();
  EXPECT_FALSE(B->Visible());
  EXPECT_EQ(Screen()->ActiveForm(), A.P);
  A->Hide();
  EXPECT_EQ(Screen()->ActiveForm(), nullptr);
  EXPECT_EQ(Sink.Log, (std::vector<String>{"show", "hide"}));
  EXPECT_THROW(Screen()->Forms(-1), EListError);
}

TEST_F(KilnForms, MonitorsAndWorkAreas) {
  TScreen* S = Screen();
  EXPECT_EQ(S->MonitorCount(), 1);
  EXPECT_EQ(S->WorkAreaRect(), Rect(0, 0, 1920, 1040));
  S->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, false},
                  {Rect(1920, 0, 3200, 1024), Rect(1920, 0, 3200, 984), 144, true}});
  EXPECT_EQ(S->PrimaryMonitor()->MonitorNum(), 1);
  EXPECT_EQ(S->PixelsPerInch(), 144);
  EXPECT_EQ(S->DesktopRect(), Rect(0, 0, 3200, 1080));
  EXPECT_EQ(S->MonitorFromPoint(Point(2000, 10))->MonitorNum(), 1);
  EXPECT_EQ(S->MonitorFromPoint(Point(-50, 500))->MonitorNum(), 0) << "the nearest";
  EXPECT_EQ(S->MonitorFromPoint(Point(-50, 500), mdNull), nullptr);
  EXPECT_EQ(S->MonitorFromPoint(Point(-50, 500), mdPrimary)->MonitorNum(), 1);
  EXPECT_EQ(S->MonitorFromRect(Rect(1800, 0, 2000, 100))->MonitorNum(), 0) << "a tie goes to the first";
  EXPECT_EQ(S->MonitorFromRect(Rect(1800, 0, 2100, 100))->MonitorNum(), 1);
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetBounds(2500, 100, 300, 200);
  EXPECT_EQ(Form->Monitor()->WorkareaRect(), Rect(1920, 0, 3200, 984));
  // Bad monitors leave the old ones.
  EXPECT_THROW(S->SetMonitors({}), EInvalidOperation);
  try {
    S->SetMonitors({{Rect(0, 0, 100, 100), Rect(0, 0, 200, 50), 96, true}});
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Monitor 0 is not valid: its bounds must not be empty, its work area must lie inside "
                           "them and its pixels per inch must be at least 1");
  }
  EXPECT_EQ(S->MonitorCount(), 2);
  S->SetMonitors({{Rect(0, 0, 800, 600), Rect(0, 0, 800, 560), 96, false}});
  EXPECT_TRUE(S->PrimaryMonitor()->Primary()) << "the first is primary when none is";
  S->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true}});
}

TEST_F(KilnForms, AFormStoredAtAnotherResolutionIsScaledWhenLoaded) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetPixelsPerInch(144);
  Form->SetClientWidth(600);
  auto* B = Make<TButton>(Form.P, Form.P, "Button1");
  B->SetBounds(30, 30, 150, 60);
  Form->SetLoading(true);
  B->SetLoading(true);
  B->Loaded();
  Form->Loaded();
  EXPECT_EQ(Form->PixelsPerInch(), 96);
  EXPECT_EQ(Form->ClientWidth(), 400);
  EXPECT_EQ(B->BoundsRect(), Rect(20, 20, 120, 60));
  // On a design surface the stored numbers stay as they are.
  TRootGuard<TForm> Designed(CreateComponentOf<TForm>(nullptr));
  Designed->SetDesigning(true);
  Designed->SetPixelsPerInch(144);
  Designed->SetLoading(true);
  Designed->Loaded();
  EXPECT_EQ(Designed->PixelsPerInch(), 144);
}

} // namespace
