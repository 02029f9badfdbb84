//===- tests/frameworks/kiln/ControlsTest.cpp - Bounds, parents, layout ---===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

/// A panel that writes down the control messages it receives.
class TRecordingPanel : public TPanel {
  FK_CLASS(TRecordingPanel, TPanel)
  std::vector<String> Log;
  void WndProc(TMessage& M) override {
    if (M.Msg == CM_CONTROLCHANGE)
      Log.push_back(Format("%s %s", M.LParam ? "+" : "-", reinterpret_cast<TControl*>(M.WParam)->Name()));
    if (M.Msg == CM_PARENTCHANGED) Log.push_back("parent changed");
    inherited::WndProc(M);
  }
};
FK_IMPLEMENT(TRecordingPanel, "ControlsTest") {}

using KilnControls = KilnTest;

TEST_F(KilnControls, EachClassHasItsOwnSize) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto Size = [&](TControl* C) { return Format("%dx%d", C->Width(), C->Height()); };
  EXPECT_EQ(Size(Form.P), "320x240");
  EXPECT_EQ(Size(CreateComponentOf<TButton>(Form.P)), "75x25");
  EXPECT_EQ(Size(CreateComponentOf<TLabel>(Form.P)), "65x17");
  EXPECT_EQ(Size(CreateComponentOf<TEdit>(Form.P)), "121x23");
  EXPECT_EQ(Size(CreateComponentOf<TCheckBox>(Form.P)), "97x19");
  EXPECT_EQ(Size(CreateComponentOf<TPanel>(Form.P)), "185x41");
  EXPECT_EQ(Size(CreateComponentOf<TFrame>(Form.P)), "320x240");
  EXPECT_TRUE(Form->ControlStyle().Contains(csAcceptsControls));
  EXPECT_TRUE(CreateComponentOf<TPanel>(Form.P)->ControlStyle().Contains(csAcceptsControls));
  EXPECT_FALSE(CreateComponentOf<TButton>(Form.P)->ControlStyle().Contains(csAcceptsControls));
}

TEST_F(KilnControls, BoundsChangeForReal) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* B = Make<TButton>(Form.P, Form.P, "Button1");
  B->SetBounds(10, 20, 30, 40);
  EXPECT_EQ(B->BoundsRect(), Rect(10, 20, 40, 60));
  EXPECT_EQ(B->ClientRect(), Rect(0, 0, 30, 40));
  B->SetLeft(5);
  B->SetWidth(-3);
  EXPECT_EQ(B->BoundsRect(), Rect(5, 20, 5, 60)) << "a negative size becomes 0";
  B->SetBoundsRect(Rect(1, 2, 3, 4));
  EXPECT_EQ(B->BoundsRect(), Rect(1, 2, 3, 4));
  Form->SetClientWidth(400);
  Form->SetClientHeight(300);
  EXPECT_EQ(Form->Width(), 416);
  EXPECT_EQ(Form->Height(), 339);
  EXPECT_EQ(Form->ClientRect(), Rect(0, 0, 400, 300));
  Form->SetBorderStyle(bsNone);
  EXPECT_EQ(Form->ClientRect(), Rect(0, 0, 416, 339));
}

TEST_F(KilnControls, ChildrenMoveBetweenParentsAndBothAreTold) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* P1 = Make<TRecordingPanel>(Form.P, Form.P, "P1");
  auto* P2 = Make<TRecordingPanel>(Form.P, Form.P, "P2");
  P1->Log.clear();
  P2->Log.clear();
  auto* B = Make<TButton>(Form.P, P1, "Button1");
  EXPECT_EQ(P1->ControlCount(), 1);
  EXPECT_EQ(P1->Controls(0), B);
  B->SetParent(P2);
  EXPECT_EQ(P1->ControlCount(), 0);
  EXPECT_EQ(P2->IndexOfControl(B), 0);
  EXPECT_EQ(B->Parent(), P2);
  EXPECT_EQ(P1->Log, (std::vector<String>{"+ Button1", "- Button1"}));
  EXPECT_EQ(P2->Log, (std::vector<String>{"+ Button1"}));
  P2->RemoveControl(B);
  EXPECT_EQ(B->Parent(), nullptr);
  EXPECT_THROW(P2->RemoveControl(B), EInvalidOperation);
  P1->InsertControl(B);
  EXPECT_EQ(B->Parent(), P1);
  EXPECT_THROW(P1->Controls(1), EListError);
  P1->Log.clear();
  P1->SetParent(P2);
  EXPECT_EQ(P1->Log, (std::vector<String>{"parent changed"}));
}

TEST_F(KilnControls, BadParentsAreRefusedAndChangeNothing) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Outer = Make<TPanel>(Form.P, Form.P, "Outer");
  auto* Inner = Make<TPanel>(Form.P, Outer, "Inner");
  auto* Label = Make<TLabel>(Form.P, Inner, "Label1");
  try {
    Outer->SetParent(Outer);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Control 'Outer' cannot be its own parent");
  }
  try {
    Outer->SetParent(Inner);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Control 'Outer' cannot be parented to 'Inner', which lies inside it");
  }
  EXPECT_EQ(Outer->Parent(), Form.P);
  EXPECT_EQ(Inner->Parent(), Outer);
  try {
    CreateComponentOf<TButton>(Form.P)->SetParentComponent(Label);
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Control 'Label1' cannot hold 'TButton': only a windowed control holds children");
  }
}

TEST_F(KilnControls, PointsConvertBySummingOffsets) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetBounds(100, 50, 400, 300);
  auto* Panel = Make<TPanel>(Form.P, Form.P, "Panel1");
  Panel->SetBounds(10, 20, 200, 100);
  auto* B = Make<TButton>(Form.P, Panel, "Button1");
  B->SetBounds(5, 7, 75, 25);
  // 100 + 8 (frame) + 10 + 5, 50 + 31 (frame and caption) + 20 + 7
  EXPECT_EQ(B->ClientOrigin(), Point(123, 108));
  EXPECT_EQ(B->ClientToScreen(Point(1, 2)), Point(124, 110));
  EXPECT_EQ(B->ScreenToClient(Point(124, 110)), Point(1, 2));
  EXPECT_EQ(B->ClientToParent(Point(1, 2), Form.P), Point(16, 29));
  EXPECT_EQ(B->ParentToClient(Point(16, 29), Form.P), Point(1, 2));
  EXPECT_EQ(B->ClientToParent(Point(1, 2), B->Parent()), Point(6, 9));
  auto* Other = Make<TPanel>(Form.P, Form.P, "Other");
  EXPECT_THROW(B->ClientToParent(Point(0, 0), Other), EInvalidOperation);
}

TEST_F(KilnControls, ControlAtPosFindsTheTopmost) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Panel = Make<TPanel>(Form.P, Form.P, "Panel1");
  Panel->SetBounds(0, 0, 200, 100);
  auto* B1 = Make<TButton>(Form.P, Panel, "B1");
  B1->SetBounds(10, 10, 50, 20);
  auto* B2 = Make<TButton>(Form.P, Panel, "B2");
  B2->SetBounds(40, 10, 50, 20);
  auto* L = Make<TLabel>(Form.P, Panel, "L");
  L->SetBounds(100, 50, 20, 20);
  EXPECT_EQ(Panel->ControlAtPos(Point(45, 15)), B2) << "the later child lies on top";
  Panel->BringToFront(B1);
  EXPECT_EQ(Panel->ControlAtPos(Point(45, 15)), B1);
  EXPECT_EQ(Panel->ControlAtPos(Point(59, 29)), B1);
  EXPECT_EQ(Panel->ControlAtPos(Point(60, 29)), B2) << "the right edge is outside";
  EXPECT_EQ(Panel->ControlAtPos(Point(60, 30)), nullptr) << "the bottom edge is outside";
  EXPECT_EQ(Panel->ControlAtPos(Point(45, 15), false, false), nullptr);
  EXPECT_EQ(Panel->ControlAtPos(Point(105, 55), false, false), L);
  B1->SetEnabled(false);
  EXPECT_EQ(Panel->ControlAtPos(Point(45, 15)), B2);
  EXPECT_EQ(Panel->ControlAtPos(Point(45, 15), true), B1);
  B2->Hide();
  EXPECT_EQ(Panel->ControlAtPos(Point(80, 15)), nullptr);
  B2->SetDesigning(true);
  EXPECT_EQ(Panel->ControlAtPos(Point(80, 15)), B2) << "hidden controls show on a design surface";
  EXPECT_EQ(Form->ControlAtPos(Point(105, 55)), Panel);
  EXPECT_EQ(Form->ControlAtPos(Point(105, 55), false, true, true), L);
}

TEST_F(KilnControls, AlignedChildrenFollowTheParent) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetBorderStyle(bsNone);
  Form->SetBounds(0, 0, 300, 200);
  auto* Top = Make<TPanel>(Form.P, Form.P, "Top");
  Top->SetHeight(30);
  Top->SetAlign(alTop);
  auto* Bottom = Make<TPanel>(Form.P, Form.P, "Bottom");
  Bottom->SetHeight(20);
  Bottom->SetAlign(alBottom);
  auto* Left = Make<TPanel>(Form.P, Form.P, "Left");
  Left->SetWidth(50);
  Left->SetAlign(alLeft);
  auto* Client = Make<TPanel>(Form.P, Form.P, "Client");
  Client->SetAlign(alClient);
  EXPECT_EQ(Top->BoundsRect(), Rect(0, 0, 300, 30));
  EXPECT_EQ(Bottom->BoundsRect(), Rect(0, 180, 300, 200));
  EXPECT_EQ(Left->BoundsRect(), Rect(0, 30, 50, 180));
  EXPECT_EQ(Client->BoundsRect(), Rect(50, 30, 300, 180));
  Form->SetBounds(0, 0, 400, 300);
  EXPECT_EQ(Bottom->BoundsRect(), Rect(0, 280, 400, 300));
  EXPECT_EQ(Client->BoundsRect(), Rect(50, 30, 400, 280));
  Top->Hide();
  EXPECT_EQ(Client->BoundsRect(), Rect(50, 0, 400, 280));
  // A bevel narrows the area that a panel's aligned children share.
  auto* Inner = Make<TButton>(Form.P, Client, "Inner");
  Inner->SetAlign(alClient);
  EXPECT_EQ(Inner->BoundsRect(), Rect(1, 1, 349, 279));
  Client->SetBorderWidth(4);
  EXPECT_EQ(Inner->BoundsRect(), Rect(5, 5, 345, 275));
  Form->DisableAlign();
  Form->SetBounds(0, 0, 100, 100);
  EXPECT_EQ(Bottom->BoundsRect(), Rect(0, 280, 400, 300)) << "held back";
  Form->EnableAlign();
  EXPECT_EQ(Bottom->BoundsRect(), Rect(0, 80, 100, 100));
}

TEST_F(KilnControls, TabOrderIsAPositionAmongWindowedSiblings) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* A = Make<TButton>(Form.P, Form.P, "A");
  Make<TLabel>(Form.P, Form.P, "L");
  auto* B = Make<TEdit>(Form.P, Form.P, "B");
  auto* C = Make<TCheckBox>(Form.P, Form.P, "C");
  EXPECT_EQ(A->TabOrder(), 0);
  EXPECT_EQ(B->TabOrder(), 1);
  EXPECT_EQ(C->TabOrder(), 2);
  C->SetTabOrder(0);
  EXPECT_EQ(A->TabOrder(), 1);
  EXPECT_EQ(B->TabOrder(), 2);
  C->SetTabOrder(99);
  EXPECT_EQ(C->TabOrder(), 2);
  EXPECT_EQ(Form->TabOrder(), -1);
  auto* D = CreateComponentOf<TButton>(Form.P);
  D->SetTabOrder(0);
  EXPECT_EQ(D->TabOrder(), -1);
  D->SetParent(Form.P);
  EXPECT_EQ(D->TabOrder(), 0) << "kept until the control has a parent";
}

TEST_F(KilnControls, CaptionFollowsTheNameUntilSetApart) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* B = Make<TButton>(Form.P, Form.P, "Button1");
  EXPECT_EQ(B->Caption(), "Button1");
  B->SetName("OkButton");
  EXPECT_EQ(B->Caption(), "OkButton");
  B->SetCaption("OK");
  B->SetName("Ok");
  EXPECT_EQ(B->Caption(), "OK");
  auto* E = Make<TEdit>(Form.P, Form.P, "Edit1");
  EXPECT_EQ(E->Text(), "Edit1");
  Form->SetName("MainForm");
  EXPECT_EQ(Form->Caption(), "MainForm");
}

TEST_F(KilnControls, FontsPassFromParentsToChildren) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Panel = Make<TPanel>(Form.P, Form.P, "Panel1");
  auto* B = Make<TButton>(Form.P, Panel, "Button1");
  Form->Font()->SetSize(12);
  EXPECT_EQ(B->Font()->Size(), 12);
  EXPECT_TRUE(B->ParentFont());
  B->Font()->SetName("Mono");
  EXPECT_FALSE(B->ParentFont());
  Form->Font()->SetSize(14);
  EXPECT_EQ(Panel->Font()->Size(), 14);
  EXPECT_EQ(B->Font()->Size(), 12) << "a font of its own stays";
  B->SetParentFont(true);
  EXPECT_EQ(B->Font()->Name(), "Sans Serif");
  EXPECT_EQ(B->Font()->Size(), 14);
}

TEST_F(KilnControls, ScalingForPixelsPerInch) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetBounds(10, 10, 416, 339);
  auto* Panel = Make<TPanel>(Form.P, Form.P, "Panel1");
  Panel->SetBounds(10, 20, 100, 50);
  EXPECT_EQ(Panel->CurrentPPI(), 96);
  EXPECT_EQ(Panel->ScaleValue(28), 28);
  Form->ScaleForPPI(144);
  EXPECT_EQ(Panel->BoundsRect(), Rect(15, 30, 165, 105));
  EXPECT_EQ(Form->ClientRect(), Rect(0, 0, 600, 450));
  EXPECT_EQ(Form->Left(), 10) << "a window keeps its place";
  EXPECT_EQ(Form->PixelsPerInch(), 144);
  EXPECT_EQ(Panel->ScaleValue(28), 42);
  EXPECT_THROW(Panel->ScaleForPPI(0), EInvalidOperation);
  ControlPPIHook = [](const TControl*) { return 192; };
  EXPECT_EQ(Panel->CurrentPPI(), 192);
  ControlPPIHook = nullptr;
}

TEST_F(KilnControls, DestroyingAContainerTakesItsChildren) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Panel = Make<TPanel>(Form.P, Form.P, "Panel1");
  Make<TButton>(Form.P, Panel, "Button1");
  Make<TLabel>(Form.P, Panel, "Label1");
  EXPECT_EQ(Form->ComponentCount(), 3);
  Panel->Destroy();
  EXPECT_EQ(Form->ComponentCount(), 0);
  EXPECT_EQ(Form->ControlCount(), 0);
}

TEST_F(KilnControls, EventsRunOnlyOffTheDesignSurface) {
  struct TSink : TObject {
    std::vector<String> Log;
    void Clicked(TObject* Sender) { Log.push_back("click " + static_cast<TComponent*>(Sender)->Name()); }
    void Changed(TObject*) { Log.push_back("change"); }
  } Sink;
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Check = Make<TCheckBox>(Form.P, Form.P, "Check1");
  auto* Edit = Make<TEdit>(Form.P, Form.P, "Edit1");
  Check->OnClick = TNotifyEvent::Bind<&TSink::Clicked>(&Sink);
  Edit->OnChange = TNotifyEvent::Bind<&TSink::Changed>(&Sink);
  Check->SetChecked(true);
  Check->SetChecked(true);
  Edit->SetText("x");
  EXPECT_THROW(Check->SetState(cbGrayed), EInvalidOperation);
  Check->SetAllowGrayed(true);
  Check->Toggle();
  EXPECT_EQ(Check->State(), cbUnchecked);
  Check->Toggle();
  EXPECT_EQ(Check->State(), cbGrayed);
  Form->SetDesigning(true);
  Check->Click();
  Edit->SetText("y");
  EXPECT_EQ(Sink.Log, (std::vector<String>{"click Check1", "change", "click Check1", "click Check1"}));
}

TEST_F(KilnControls, PaintingRecordsOnTheCanvas) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Panel = Make<TPanel>(Form.P, Form.P, "Panel1");
  Panel->SetBounds(0, 0, 100, 40);
  auto* Label = Make<TLabel>(Form.P, Panel, "Label1");
  TObjectGuard<TCanvas> C(new TCanvas);
  Panel->Paint(C.Get());
  Label->Paint(C.Get());
  EXPECT_EQ(C->Text(),
            "FillRect(0,0,100,40)\n"
            "FrameRect(0,0,100,40)\n"
            "TextOut(32,14,\"Panel1\")\n"
            "FillRect(0,0,65,17)\n"
            "TextOut(0,0,\"Label1\")\n");
}

} // namespace
