//===- tests/desktop/DockableFormTest.cpp - Tab or join by the drop point ===//
#include "desktop/DockForm.h"
#include "desktop/IDEDockPanel.h"
#include "frameworks/kiln/KilnDockTree.h"
#include "tests/desktop/DesktopTestSupport.h"

namespace formkit::desktoptest {
namespace {

/// A host that docks what it is given into its zones, as the hosts of tabs and joins do.
class TTestDockHost : public TDockableForm, public TDockHostLink {
  FK_CLASS(TTestDockHost, TDockableForm)
public:
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    SetBorderStyle(bsNone);
    SetDockManager(this, New<TDockTree>(this));
  }
  TIDEDockType HostDockType() const override { return dtTab; }
  void ManualDockClient(TControl* Client, TControl* DropControl, TAlign DockAlign, bool Focus) override {
    ManualDock(Client, this, DropControl, DockAlign);
    Focused.push_back(Focus);
  }
  void ResetStayOnTop() override { ++StayOnTopResets; }
  /// A host takes drops into its zones itself.
  void CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result) override {
    TDockHandler::CMDockClient(Source, MousePos, Result);
  }
  std::vector<bool> Focused;
  int StayOnTopResets = 0;
};

class TTestJoinHost : public TTestDockHost {
  FK_CLASS(TTestJoinHost, TTestDockHost)
public:
  TIDEDockType HostDockType() const override { return dtJoin; }
};

class TToolWindow : public TDockableForm {
  FK_CLASS(TToolWindow, TDockableForm)
};

FK_IMPLEMENT(TTestDockHost, "DockableFormTest") {}
FK_IMPLEMENT(TTestJoinHost, "DockableFormTest") {}
FK_IMPLEMENT(TToolWindow, "DockableFormTest") {}

class DockableForms : public DesktopTest {
protected:
  void SetUp() override {
    DesktopTest::SetUp();
    RegisterDockHostClass(dtTab, TTestDockHost::StaticClass());
    RegisterDockHostClass(dtJoin, TTestJoinHost::StaticClass());
  }
  void TearDown() override {
    RegisterDockHostClass(dtTab, nullptr);
    RegisterDockHostClass(dtJoin, nullptr);
    DesktopTest::TearDown();
  }

  /// A visible floating tool window without a frame at `R`.
  TToolWindow* Tool(const String& Name, const TRect& R) {
    auto* W = CreateComponentOf<TToolWindow>(Application());
    W->SetName(Name);
    W->SetCaption(Name + " Caption");
    W->SetBorderStyle(bsNone);
    W->SetBoundsRect(R);
    W->Show();
    return W;
  }

  template <class T> static T* HostOf(TControl* C) { return dynamic_cast<T*>(HostDockSite(C)); }
};

TEST_F(DockableForms, TabZoneAndWhoMayDockWhere) {
  TToolWindow* Small = Tool("Small", Bounds(200, 100, 70, 50));
  EXPECT_EQ(Small->GetTabDockRect(), Rect(210, 110, 260, 140)) << "inset by 70 div 7 and 50 div 5";
  EXPECT_TRUE(IsDockSite(Small));
  EXPECT_EQ(Small->DragKind(), dkDock);
  EXPECT_EQ(Small->DragMode(), dmAutomatic);
  TActionList* L = Small->DockActionList();
  ASSERT_EQ(L->ActionCount(), 5);
  std::vector<String> Captions;
  for (int I = 0; I < L->ActionCount(); ++I)
    Captions.push_back(L->Actions(I)->Name() + "=" + L->Actions(I)->Caption() + (L->Actions(I)->Visible() ? "" : " (hidden)"));
  EXPECT_EQ(Captions, (std::vector<String>{"DockableCmd=&Dockable", "StayOnTopCmd=&Stay on Top",
                                           "ZoomWindowCmd=Zoom Window (hidden)", "CloseUndockedWindowCmd=Close (hidden)",
                                           "LocalMenuCmd=Local Menu (hidden)"}));
  EXPECT_TRUE(Small->DockableCmd()->Checked());

  TToolWindow* Other = Tool("Other", Bounds(600, 100, 300, 200));
  auto* Plain = CreateComponentOf<TForm>(Application());
  auto* Join = CreateComponentOf<TTestJoinHost>(Application());
  TRect Influence;
  bool Can = true;
  // Floating: any dockable form anywhere in the window, but no join host or plain form.
  Small->GetSiteInfo(Other, Influence, Point(201, 101), Can);
  EXPECT_TRUE(Can);
  Small->GetSiteInfo(Join, Influence, Point(230, 120), Can);
  EXPECT_FALSE(Can) << "a join host cannot be a tab or a neighbour";
  Can = true;
  Small->GetSiteInfo(Plain, Influence, Point(230, 120), Can);
  EXPECT_FALSE(Can);

  // Docked: only in the tab zone; and two forms of one host never dock on each other.
  auto* Host = CreateComponentOf<TTestDockHost>(Application());
  Host->SetBounds(0, 0, 700, 500);
  ManualDock(Small, Host);
  TRect Tab = Small->GetTabDockRect();
  Small->GetSiteInfo(Other, Influence, Point(Tab.Left, Tab.Top), Can);
  EXPECT_TRUE(Can);
  Small->GetSiteInfo(Other, Influence, Point(Tab.Left - 1, Tab.Top), Can);
  EXPECT_FALSE(Can);
  ManualDock(Other, Host);
  Small->GetSiteInfo(Other, Influence, Point(Tab.Left, Tab.Top), Can);
  EXPECT_FALSE(Can);
}

TEST_F(DockableForms, DropInTheMiddleMakesTabsWithAPreview) {
  TToolWindow* Target = Tool("Target", Rect(100, 100, 450, 350));
  TToolWindow* Dragged = Tool("Dragged", Rect(900, 500, 1100, 700));
  TRect Tab = Target->GetTabDockRect();
  EXPECT_EQ(Tab, Rect(150, 150, 400, 300));
  {
    TDockDrag Drag(Dragged);
    auto* Object = dynamic_cast<TIDEDragDockObject*>(Drag.DragObject());
    ASSERT_NE(Object, nullptr) << "a dockable form drags with the preview window";
    EXPECT_FALSE(Object->GetEraseWhenMoving());
    EXPECT_EQ(Object->BlendForm()->AlphaBlendValue(), 220);
    EXPECT_EQ(Object->BlendForm()->BorderStyle(), bsNone);
    EXPECT_EQ(Object->CaptionLabel()->Caption(), "Dragged Caption");
    EXPECT_EQ(Object->CaptionLabel()->BoundsRect().TopLeft(), Point(8, 8));
    EXPECT_TRUE(Object->CaptionLabel()->Font()->Style().Contains(fsBold));
    EXPECT_FALSE(Object->BlendForm()->Visible());
    EXPECT_EQ(Dragged->ParentDrag(), nullptr);

    Drag.MoveTo(Point(275, 225));
    EXPECT_EQ(Object->DragTarget(), Target);
    EXPECT_EQ(Target->IDEDockType(), dtTab);
    EXPECT_EQ(Object->DockRect(), Tab);
    EXPECT_TRUE(Object->BlendForm()->Visible());
    EXPECT_EQ(Object->BlendForm()->BoundsRect(), Tab);

    ASSERT_TRUE(Drag.Drop());
    EXPECT_FALSE(Object->BlendForm()->Visible());
  }
  auto* Host = HostOf<TTestDockHost>(Target);
  ASSERT_NE(Host, nullptr);
  EXPECT_EQ(Host->HostDockType(), dtTab);
  EXPECT_EQ(HostDockSite(Dragged), Host);
  EXPECT_EQ(DockClients(Host), (std::vector<TControl*>{Target, Dragged}));
  EXPECT_EQ(Host->Focused, (std::vector<bool>{true, false}));
  EXPECT_EQ(Host->BoundsRect(), Rect(100, 100, 450, 350)) << "the host takes the target's place";
  EXPECT_TRUE(Host->Visible());
  EXPECT_EQ(Screen()->ActiveForm(), Host);
  EXPECT_FALSE(Target->HasIDETitleBar());
  ProcessMessages();
  EXPECT_FALSE(Dragged->HasIDETitleBar()) << "a docked form loses its title bar";

  // Dragged out again into the open: it floats with its own title bar.
  {
    TDockDrag Drag(Dragged);
    Drag.MoveTo(Point(1500, 800));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), nullptr);
    EXPECT_TRUE(Drag.Drop());
  }
  EXPECT_EQ(HostDockSite(Dragged), nullptr);
  EXPECT_EQ(Dragged->ParentDrag(), Host);
  EXPECT_TRUE(Dragged->HasIDETitleBar());
  EXPECT_EQ(DockClients(Host), (std::vector<TControl*>{Target}));
}

TEST_F(DockableForms, DropAtAnEdgeJoinsOnTheHalfAtThatEdge) {
  TToolWindow* Target = Tool("Target", Rect(100, 100, 451, 351));
  TToolWindow* Dragged = Tool("Dragged", Rect(900, 500, 1100, 700));
  TToolWindow* Third = Tool("Third", Rect(1200, 100, 1500, 400));
  {
    TDockDrag Drag(Dragged);
    Drag.MoveTo(Point(275, 110));
    EXPECT_EQ(Target->IDEDockType(), dtJoin);
    EXPECT_EQ(Target->DockEdge(), alTop);
    EXPECT_EQ(Drag.DragObject()->DockRect(), Rect(100, 100, 451, 226)) << "the upper half";
    Drag.MoveTo(Point(440, 225));
    EXPECT_EQ(Target->DockEdge(), alRight);
    EXPECT_EQ(Drag.DragObject()->DockRect(), Rect(275, 100, 451, 351)) << "half of 351 is 175";
    Drag.MoveTo(Point(275, 110));
    ASSERT_TRUE(Drag.Drop());
  }
  auto* Join = HostOf<TTestJoinHost>(Target);
  ASSERT_NE(Join, nullptr);
  EXPECT_EQ(Join->HostDockType(), dtJoin);
  EXPECT_EQ(Join->Focused, (std::vector<bool>{false, false}));
  // Above the target, each half of 251 less the splitter of 4, rounded half away from 0.
  EXPECT_EQ(Dragged->BoundsRect(), Rect(0, 0, 351, 124));
  EXPECT_EQ(Target->BoundsRect(), Rect(0, 128, 351, 251));

  // A join host dragged over a form finds no place there; forms of one host do not dock
  // on each other, and a docked form takes a drop only in its tab zone.
  {
    TDockDrag Drag(Join);
    Drag.MoveTo(Point(1350, 250));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), nullptr);
  }
  {
    TDockDrag Drag(Dragged);
    TRect Tab = Target->GetTabDockRect();
    Drag.MoveTo(Point(Tab.Left + 1, Tab.Top + 1));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), Join) << "the host around it, not the neighbour";
  }
  {
    TDockDrag Drag(Third);
    TRect Tab = Target->GetTabDockRect();
    Drag.MoveTo(Point(Tab.Left + 1, Tab.Top + 1));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), Target);
    Drag.MoveTo(Point(Tab.Left - 1, Tab.Top + 1));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), Join) << "outside the tab zone the edges are the host's";
  }
}

TEST_F(DockableForms, DockableStayOnTopZoomAndClose) {
  TToolWindow* W = Tool("W", Rect(100, 100, 400, 300));
  auto* Host = CreateComponentOf<TTestDockHost>(Application());
  Host->SetBounds(0, 0, 700, 500);
  Host->Show();
  ManualDock(W, Host);

  W->CloseUndockedWindowCmd()->Execute();
  EXPECT_TRUE(W->Visible()) << "a docked form does not close this way";
  W->ZoomWindowCmd()->Execute();
  EXPECT_EQ(Host->WindowState(), wsMaximized) << "a docked form zooms its parent form";
  W->ZoomWindowCmd()->Execute();
  EXPECT_EQ(Host->WindowState(), wsNormal);

  W->SetStayOnTop(true);
  EXPECT_EQ(W->FormStyle(), fsStayOnTop);
  EXPECT_TRUE(W->StayOnTopCmd()->Checked());
  EXPECT_EQ(Host->StayOnTopResets, 1);
  W->StayOnTopCmd()->Execute();
  EXPECT_EQ(W->FormStyle(), fsNormal);
  W->StayOnTopCmd()->Update();
  EXPECT_FALSE(W->StayOnTopCmd()->Checked());

  W->SetDockable(false);
  EXPECT_EQ(HostDockSite(W), nullptr) << "no longer dockable, a docked form floats first";
  EXPECT_FALSE(IsDockSite(W));
  EXPECT_EQ(W->DragKind(), dkDrag);
  EXPECT_EQ(W->DragMode(), dmManual);
  EXPECT_FALSE(W->DockableCmd()->Checked());
  EXPECT_TRUE(W->ToggleDockable());
  EXPECT_TRUE(IsDockSite(W));
  W->DockableCmd()->Execute();
  EXPECT_FALSE(W->Dockable());

  W->ZoomWindowCmd()->Execute();
  EXPECT_EQ(W->WindowState(), wsMaximized);
  W->ZoomWindowCmd()->Execute();
  W->CloseUndockedWindowCmd()->Execute();
  EXPECT_FALSE(W->Visible());

  W->ForceShow();
  EXPECT_TRUE(W->Visible());
  W->SetBounds(100, 100, 300, 200);
  auto* Menu = CreateComponentOf<TPopupMenu>(W);
  W->SetPopupMenu(Menu);
  W->LocalMenuCmd()->Execute();
  EXPECT_EQ(Menu->PopupCount(), 1);
  EXPECT_EQ(Menu->PopupPoint(), Point(200, 166)) << "a third into the client area of 300 by 200";
  Menu->Destroy();
  EXPECT_EQ(W->PopupMenu(), nullptr);
  W->LocalMenuCmd()->Execute();
  ManualDock(W, Host);
  Host->Hide();
  W->ForceShow();
  EXPECT_TRUE(Host->Visible()) << "shown with every parent above it";
}

TEST_F(DockableForms, DarkPreviewsAndOlderSystemsWithoutTitleBars) {
  ThemeWindowColor = 0x00202020;
  OperatingSystemMajorVersion = 6;
  auto Restore = Finally([]() noexcept {
    ThemeWindowColor = 0x00FFFFFF;
    OperatingSystemMajorVersion = 10;
  });
  TToolWindow* W = Tool("W", Rect(100, 100, 400, 300));
  EXPECT_FALSE(W->SupportsIDETitlebar());
  EXPECT_FALSE(W->HasIDETitleBar());
  auto* Plain = CreateComponentOf<TForm>(Application());
  TIDEDragDockObject Preview(Plain);
  EXPECT_EQ(Preview.BlendForm()->AlphaBlendValue(), 200);
  EXPECT_EQ(Preview.CaptionLabel()->Caption(), "Windows");
  EXPECT_EQ(Preview.BlendForm()->HitTest(Point(1, 1)), TBlendForm::HTTRANSPARENT);
}

TEST_F(DockableForms, ATabInAnEditorPanelTakesTheTargetsPlace) {
  auto* Editor = CreateComponentOf<TForm>(Application());
  Editor->SetBorderStyle(bsNone);
  Editor->SetBounds(0, 0, 1600, 900);
  auto* Panel = CreateComponentOf<TEditorDockPanel>(Editor);
  Panel->SetParent(Editor);
  Panel->SetAlign(alLeft);
  Panel->SetWidth(400);
  Editor->Show();
  TToolWindow* Upper = Tool("Upper", Rect(900, 100, 1100, 300));
  TToolWindow* Lower = Tool("Lower", Rect(900, 100, 1100, 300));
  ManualDock(Upper, Panel);
  ManualDock(Lower, Panel, Upper, alBottom);
  TRect UpperPlace = Upper->BoundsRect();
  TToolWindow* Dragged = Tool("Dragged", Rect(1200, 500, 1400, 700));
  {
    TDockDrag Drag(Dragged);
    TRect Tab = Upper->GetTabDockRect();
    Drag.MoveTo(Point(Tab.Left + 5, Tab.Top + 5));
    EXPECT_EQ(Drag.DragObject()->DragTarget(), Upper);
    ASSERT_TRUE(Drag.Drop());
  }
  auto* Host = HostOf<TTestDockHost>(Upper);
  ASSERT_NE(Host, nullptr);
  EXPECT_EQ(HostDockSite(Host), Panel) << "the host stands in the panel where the target stood";
  EXPECT_EQ(Host->BoundsRect(), UpperPlace);
  EXPECT_EQ(DockClients(Panel), (std::vector<TControl*>{Lower, Host}));
  EXPECT_EQ(DockClients(Host), (std::vector<TControl*>{Upper, Dragged}));
  EXPECT_EQ(Panel->Width(), 400) << "the panel did not collapse on the way";
  EXPECT_FALSE(Panel->ResizeSuspended());
}

TEST_F(DockableForms, LandingOnAnotherResolutionRescales) {
  Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true},
                         {Rect(1920, 0, 3840, 1080), Rect(1920, 0, 3840, 1040), 144, false}});
  TToolWindow* W = Tool("W", Rect(100, 100, 300, 250));
  TDockDrag Drag(W);
  Drag.MoveTo(Point(2400, 300));
  ASSERT_TRUE(Drag.Drop());
  EXPECT_EQ(W->CurrentPPI(), 144);
  EXPECT_EQ(W->Width(), 300) << "scaled by 144 / 96";
  EXPECT_TRUE(RedrawEnabled(W)) << "drawing is thawed again";
}

TEST_F(DockableForms, WithoutAHostClassADropDocksIntoTheForm) {
  RegisterDockHostClass(dtTab, nullptr);
  TToolWindow* Target = Tool("Target", Rect(100, 100, 450, 350));
  TToolWindow* Dragged = Tool("Dragged", Rect(900, 500, 1100, 700));
  TDockDrag Drag(Dragged);
  Drag.MoveTo(Point(275, 225));
  ASSERT_TRUE(Drag.Drop());
  EXPECT_EQ(HostDockSite(Dragged), Target);
}

} // namespace
} // namespace formkit::desktoptest
