//===- tests/desktop/DockHostFormsTest.cpp - Tab and join hosts ----------===//
#include "desktop/DockHostForms.h"
#include "frameworks/kiln/KilnWindows.h"
#include "tests/desktop/DesktopTestSupport.h"

#include <cctype>

namespace formkit::desktoptest {
namespace {

/// A tool window that counts the times it lost its place as the focused client.
class THostedTool : public TDockableForm {
  FK_CLASS(THostedTool, TDockableForm)
public:
  int Deactivations = 0;

protected:
  void WndProc(TMessage& Message) override {
    if (Message.Msg == CMDockClientDeactivate) ++Deactivations;
    inherited::WndProc(Message);
  }
};

/// The class name of the source editor's window, which tab hosts refuse.
class TEditWindow : public TDockableForm {
  FK_CLASS(TEditWindow, TDockableForm)
};

/// A tool window the registry makes, named and captioned after its section, as a join
/// host's tree finds its clients by name.
class TSectionTool : public THostedTool, public IDesktopFormCreator {
  FK_CLASS(TSectionTool, THostedTool)
  FK_INTERFACES(IDesktopFormCreator)
public:
  void SetDeskSection(const String& ASection) override {
    THostedTool::SetDeskSection(ASection);
    SetName(ASection);
    SetCaption(ASection);
  }
};

/// A control that takes the dialog character its caption marks with "&" while it and
/// every parent are visible.
class TAccelBox : public TWinControl {
  FK_CLASS(TAccelBox, TWinControl)
public:
  int Taken = 0;

protected:
  void WndProc(TMessage& Message) override {
    if (Message.Msg != CM_DIALOGCHAR) return inherited::WndProc(Message);
    std::size_t Amp = Caption().find('&');
    bool Mine = Amp + 1 < Caption().size() && std::tolower(static_cast<unsigned char>(Caption()[Amp + 1])) ==
                                                   std::tolower(static_cast<int>(Message.WParam));
    for (TControl* C = this; C && Mine; C = C->Parent()) Mine = C->Visible();
    if (!Mine) return;
    ++Taken;
    Message.Result = 1;
  }
};

FK_IMPLEMENT(THostedTool, "DockHostFormsTest") {}
FK_IMPLEMENT(TEditWindow, "DockHostFormsTest") {}
FK_IMPLEMENT(TSectionTool, "DockHostFormsTest") {}
FK_IMPLEMENT(TAccelBox, "DockHostFormsTest") {}

/// The hosts come with the desktop's start, which the fixture runs.
class DockHosts : public DesktopTest {
protected:
  THostedTool* Tool(const String& Name, const TRect& R) {
    auto* W = MakeWindow<THostedTool>(Name);
    W->SetName(Name);
    W->SetCaption(Name + " Caption");
    W->SetBorderStyle(bsNone);
    W->SetBoundsRect(R);
    W->Show();
    return W;
  }

  /// Drags `Dragged` onto `P` and drops it there.
  static void DropAt(TControl* Dragged, TPoint P) {
    TDockDrag Drag(Dragged);
    Drag.MoveTo(P);
    ASSERT_TRUE(Drag.Drop());
  }

  template <class T> static T* HostOf(TControl* C) { return dynamic_cast<T*>(HostDockSite(C)); }

  static std::vector<String> TabTexts(TTabDockHostForm* Host) {
    std::vector<String> Texts;
    for (int I = 0; I < Host->DockTab()->TabCount(); ++I) Texts.push_back(Host->DockTab()->TabText(I));
    return Texts;
  }

  /// Every client's tab index, in the list order.
  static std::vector<int> TabIndexes(TTabDockHostForm* Host) {
    std::vector<int> Indexes;
    for (int I = 0; I < Host->DockInfoCount(); ++I) Indexes.push_back(Host->DockInfo(I)->TabIndex());
    return Indexes;
  }
};

TEST_F(DockHosts, StartingTheDesktopRegistersTheHostsAndStoppingItWithdrawsThem) {
  EXPECT_EQ(DockHostClass(dtTab), TTabDockHostForm::StaticClass());
  EXPECT_EQ(DockHostClass(dtJoin), TJoinDockForm::StaticClass());
  // The registry knows the host class under its section, with no instance of its own.
  RegisterDesktopFormClass(TBaseDockHostForm::StaticClass(), "Probe", "Probe");
  EXPECT_EQ(GetInstanceName(TBaseDockHostForm::StaticClass(), "DockSite"), "");
  EXPECT_EQ(GetInstanceName(TBaseDockHostForm::StaticClass(), String()), "")
      << "the section \"DockSite\" is registered first, with an empty instance name";
  UnregisterDesktopFormClass(TBaseDockHostForm::StaticClass());
  RegisterDesktopFormClass(TBaseDockHostForm::StaticClass(), "Probe", "Probe");
  EXPECT_EQ(GetInstanceName(TBaseDockHostForm::StaticClass(), String()), "Probe");
  UnregisterDesktopFormClass(TBaseDockHostForm::StaticClass());

  // A nested start and stop leave them; the last stop withdraws them.
  InitializeDesktop();
  FinalizeDesktop();
  EXPECT_EQ(DockHostClass(dtTab), TTabDockHostForm::StaticClass());
  FinalizeDesktop();
  EXPECT_EQ(DockHostClass(dtTab), nullptr);
  EXPECT_EQ(DockHostClass(dtJoin), nullptr);
  {
    THostedTool* Target = Tool("Target", Rect(100, 100, 450, 350));
    THostedTool* Dragged = Tool("Dragged", Rect(900, 500, 1100, 700));
    TDockDrag Drag(Dragged);
    Drag.MoveTo(Point(275, 225));
    (void)Drag.Drop();
    EXPECT_EQ(HostDockSite(Target), nullptr) << "without the hosts a drop makes none";
    EXPECT_TRUE(HostDockFormList().empty());
  }
  InitializeDesktop(); // the fixture stops it once more
  THostedTool* Target = Tool("Target2", Rect(100, 400, 450, 650));
  THostedTool* Dragged = Tool("Dragged2", Rect(900, 100, 1100, 300));
  DropAt(Dragged, Point(275, 525));
  EXPECT_NE(HostOf<TTabDockHostForm>(Target), nullptr);
}

TEST_F(DockHosts, DropInTheMiddleMakesATabHostThatDissolvesWithOneClientLeft) {
  THostedTool* Target = Tool("Target", Rect(100, 100, 450, 350));
  THostedTool* Dragged = Tool("Dragged", Rect(900, 500, 1100, 700));
  DropAt(Dragged, Point(275, 225));
  auto* Host = HostOf<TTabDockHostForm>(Target);
  ASSERT_NE(Host, nullptr);
  EXPECT_EQ(HostDockSite(Dragged), Host);
  EXPECT_EQ(DockHostClass(dtTab), TTabDockHostForm::StaticClass());
  EXPECT_EQ(DockHostClass(dtJoin), TJoinDockForm::StaticClass());
  EXPECT_EQ(HostDockFormList(), (std::vector<TBaseDockHostForm*>{Host}));
  EXPECT_EQ(Host->HostDockNumber(), -1);
  EXPECT_TRUE(Host->AllowAdjustPosForDPI());
  EXPECT_EQ(Host->BoundsRect(), Rect(100, 100, 450, 350));
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"Target Caption", "Dragged Caption"}));
  EXPECT_TRUE(Host->DockTab()->Visible()) << "two tabs show the strip";
  EXPECT_EQ(Host->DockTab()->Align(), alBottom);
  EXPECT_EQ(Host->DockTab()->TabIndex(), 1) << "the last client shown is in front";
  EXPECT_EQ(Host->Caption(), "Dragged Caption");
  EXPECT_EQ(Host->ActivePage(), Host->GetDockClientInfo(Dragged)->TabSheet());
  EXPECT_EQ(Dragged->Parent(), Host->ActivePage());
  EXPECT_FALSE(Host->GetDockClientInfo(Target)->TabSheet()->Visible());
  EXPECT_FALSE(IsDockSite(Target)) << "tabs do not nest";
  EXPECT_EQ(Host->GetDockClientInfoFromTab(0)->DockClient(), Target);
  EXPECT_EQ(Host->GetDockClientInfoFromTab(-1), nullptr);

  // Captions follow the clients.
  Dragged->SetCaption("Renamed");
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"Target Caption", "Renamed"}));
  EXPECT_EQ(Host->Caption(), "Renamed");
  Target->SetCaption(String());
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"Untitled Window", "Renamed"}));
  EXPECT_EQ(Host->Caption(), "Renamed") << "not the selected tab";
  Target->SetCaption("Target Caption");

  // Choosing a tab brings its page to the front and names the host after it.
  Host->DockTab()->SetTabIndex(0);
  EXPECT_EQ(Host->Caption(), "Target Caption");
  EXPECT_EQ(Host->ActivePage(), Host->GetDockClientInfo(Target)->TabSheet());
  EXPECT_FALSE(Host->GetDockClientInfo(Dragged)->TabSheet()->Visible());

  // A client dragged out into the open: one is left, and the host ends at the next cycle.
  {
    TDockDrag Drag(Dragged);
    Drag.MoveTo(Point(1500, 800));
    ASSERT_TRUE(Drag.Drop());
  }
  EXPECT_TRUE(IsDockSite(Dragged)) << "a form out of a tab host is a dock site again";
  EXPECT_EQ(Dragged->Align(), alNone);
  EXPECT_EQ(HostDockSite(Target), Host) << "the host waits for the message cycle";
  EXPECT_FALSE(Host->DockTab()->Visible());
  ProcessMessages();
  EXPECT_EQ(HostDockSite(Target), nullptr);
  EXPECT_EQ(Target->Parent(), nullptr);
  EXPECT_EQ(Target->BoundsRect(), Rect(100, 100, 450, 350)) << "where the host stood, with its own size";
  EXPECT_TRUE(HostDockFormList().empty()) << "the host is freed";
}

TEST_F(DockHosts, ADockedHostGivesItsPlaceToTheLastClient) {
  auto* Site = CreateComponentOf<TForm>(Application());
  Site->SetBounds(0, 0, 800, 600);
  SetDockSite(Site, true);
  THostedTool* A = Tool("A", Rect(100, 100, 400, 300));
  THostedTool* B = Tool("B", Rect(500, 100, 800, 300));
  auto* Host = CreateComponentOf<TTabDockHostForm>(Application());
  Host->ManualDockClient(A, nullptr, alNone, false);
  Host->ManualDockClient(B, nullptr, alNone, false);
  ManualDock(Host, Site);
  ASSERT_EQ(HostDockSite(Host), Site);
  EXPECT_EQ(Host->DockInfoCount(), 2);

  // A client that goes away while docked also ends the host.
  B->Destroy();
  Vars["B"] = nullptr;
  EXPECT_EQ(Host->DockInfoCount(), 1);
  ProcessMessages();
  EXPECT_EQ(HostDockSite(A), Site) << "the last client takes the host's place";
  EXPECT_TRUE(HostDockFormList().empty());
  Site->Destroy();
}

TEST_F(DockHosts, TabsMoveCloseUpAndHideWithTheirClients) {
  THostedTool* Tools[4];
  auto* Host = CreateComponentOf<TTabDockHostForm>(Application());
  for (int I = 0; I < 4; ++I) {
    Tools[I] = Tool("T" + std::to_string(I), Bounds(100 * I, 0, 90, 90));
    Host->ManualDockClient(Tools[I], nullptr, alNone, false);
  }
  ASSERT_EQ(TabIndexes(Host), (std::vector<int>{0, 1, 2, 3}));
  // From 1 to 3: 2 and 3 shift down, no index twice.
  Host->GetDockClientInfo(Tools[1])->SetTabIndex(3);
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{0, 3, 1, 2}));
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"T0 Caption", "T2 Caption", "T3 Caption", "T1 Caption"}));
  // And back from 3 to 0.
  Host->GetDockClientInfo(Tools[1])->SetTabIndex(0);
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{1, 0, 2, 3}));
  for (int I = 0; I < 4; ++I) EXPECT_EQ(Host->GetDockClientInfoFromTab(Host->DockInfo(I)->TabIndex()), Host->DockInfo(I));
  // A drag over the strip that ends where it began restores the order.
  TTabDockInfo* Moving = Host->GetDockClientInfo(Tools[2]);
  Moving->BeginDragging();
  Moving->SetTabIndex(0);
  Moving->EndDragging();
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{1, 0, 2, 3}));

  // A window put in a client's place takes its tab; the client floats.
  THostedTool* Stand = Tool("Stand", Bounds(600, 600, 90, 90));
  Host->ManualDockClient(Stand, Tools[3], alNone, true);
  EXPECT_EQ(HostDockSite(Tools[3]), nullptr);
  EXPECT_EQ(Host->GetDockClientInfo(Stand)->TabIndex(), 3);
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"T1 Caption", "T0 Caption", "T2 Caption", "Stand Caption"}));
  Host->ManualDockClient(Tools[3], Stand, alNone, true);
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{1, 0, 2, 3}));

  // The strip refuses positions it does not have and stays as it was.
  try {
    Host->DockTab()->MoveTab(0, 4);
    ADD_FAILURE() << "no tab 4";
  } catch (const EListError& E) {
    EXPECT_STREQ(E.what(), "Tab index out of bounds (4)");
  }
  EXPECT_THROW(Host->DockTab()->SetTabIndex(-2), EListError);
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{1, 0, 2, 3}));

  // Hiding a client takes its tab, not its place in the host.
  Tools[0]->Hide();
  EXPECT_EQ(Host->DockInfoCount(), 4);
  EXPECT_EQ(Host->GetDockClientInfo(Tools[0])->TabIndex(), -1);
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{-1, 0, 1, 2}));
  Tools[0]->Show();
  EXPECT_EQ(Host->GetDockClientInfo(Tools[0])->TabIndex(), 3) << "shown again, it gets the last tab";
  EXPECT_EQ(Host->DockTab()->TabIndex(), 3);

  // The menu of the strip: positions and hiding the tab under the cursor.
  std::vector<String> Items;
  for (int I = 0; I < 6; ++I) Items.push_back(Host->MenuItem(I)->Name() + "=" + Host->MenuItem(I)->Caption());
  EXPECT_EQ(Items, (std::vector<String>{"mnuTop=&Top", "mnuBottom=&Bottom", "mnuLeft=&Left", "mnuRight=&Right", "N2=-",
                                        "mnuHideTab=&Hide"}));
  EXPECT_EQ(Host->TabPosPopupMenu()->Items()->Count(), 6);
  Host->MenuItem(3)->Click();
  EXPECT_EQ(Host->DockTab()->TabPosition(), tpRight);
  EXPECT_EQ(Host->DockTab()->Align(), alRight);
  EXPECT_TRUE(Host->MenuItem(3)->Checked());
  EXPECT_FALSE(Host->MenuItem(0)->Checked());
  Host->SetDockTabPosition(tpTop);
  Host->TabPosPopupMenuPopup(Point(-50, -50));
  EXPECT_FALSE(Host->MenuItem(5)->Enabled()) << "no tab under the cursor";
  EXPECT_TRUE(Host->MenuItem(0)->Checked());
  EXPECT_FALSE(Host->MenuItem(3)->Checked());
  TPoint First = Host->DockTab()->ClientToScreen(Point(1, 1));
  Host->TabPosPopupMenuPopup(First);
  EXPECT_TRUE(Host->MenuItem(5)->Enabled());
  EXPECT_EQ(Host->DockTab()->TabIndex(), 0);
  Host->MenuItem(5)->Click();
  EXPECT_FALSE(Tools[1]->Visible()) << "the client of tab 0";
  EXPECT_EQ(Host->DockTab()->TabCount(), 3);
  for (int Left = 2; Left > 0; --Left) {
    Host->TabPosPopupMenuPopup(First);
    Host->MenuItem(5)->Click();
  }
  EXPECT_EQ(Host->DockTab()->TabCount(), 1);
  EXPECT_FALSE(Host->DockTab()->Visible()) << "one tab hides the strip";
  EXPECT_TRUE(Host->Visible());
  Host->TabPosPopupMenuPopup(Host->DockTab()->ClientToScreen(Point(1, 1)));
  Host->MenuItem(5)->Click();
  EXPECT_EQ(Host->DockTab()->TabCount(), 0);
  EXPECT_FALSE(Host->Visible()) << "with no tab left the host hides";
  Host->Destroy();
}

TEST_F(DockHosts, HostsSaveTheirClientsAndLoadThemBack) {
  auto* Host = CreateComponentOf<TTabDockHostForm>(Application());
  Host->SetDeskSection("DockSite0");
  Host->SetBounds(100, 100, 400, 300);
  THostedTool* A = Tool("Alpha", Bounds(0, 0, 100, 100));
  THostedTool* B = Tool("Beta", Bounds(0, 0, 100, 100));
  THostedTool* C = Tool("Gamma", Bounds(0, 0, 100, 100));
  for (TControl* T : {static_cast<TControl*>(A), static_cast<TControl*>(B), static_cast<TControl*>(C)})
    Host->ManualDockClient(T, nullptr, alNone, false);
  Host->Show();
  A->Hide();
  Host->DockTab()->SetTabIndex(0);
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(String()));
  Host->SaveWindowState(Desktop.Get(), false);
  EXPECT_EQ(Desktop->ReadString("DockSite0", "TabPosition", "?"), "1");
  EXPECT_EQ(Desktop->ReadString("DockSite0", "ActiveTabID", "?"), "Beta");
  EXPECT_EQ(Desktop->ReadString("DockSite0", "TabDockClients", "?"), "Beta,Gamma,Alpha") << "no tab goes last";
  EXPECT_EQ(Desktop->ReadString("DockSite0", "Create", "?"), "1");

  // Loaded into a new host: clients in the listed order, "ActiveTabID" before "ActiveTab".
  Desktop->WriteString("DockSite0", "TabPosition", "0");
  Desktop->WriteString("DockSite0", "ActiveTab", "beta caption");
  Desktop->WriteString("DockSite0", "ActiveTabID", "Gamma");
  for (auto* T : {A, B, C}) {
    ManualFloat(T, Bounds(0, 0, 100, 100));
    T->Show();
    Loaded->AddObject(T->DeskSection(), T);
  }
  ProcessMessages();
  EXPECT_TRUE(HostDockFormList().empty());
  auto* Again = CreateComponentOf<TTabDockHostForm>(Application());
  Again->SetDeskSection("DockSite0");
  Again->LoadWindowState(Desktop.Get());
  EXPECT_EQ(TabTexts(Again), (std::vector<String>{"Beta Caption", "Gamma Caption", "Alpha Caption"}));
  EXPECT_EQ(Again->DockTab()->TabPosition(), tpTop);
  EXPECT_EQ(Again->DockTab()->TabIndex(), 1);
  EXPECT_EQ(Again->Caption(), "Gamma Caption");
  Desktop->WriteString("DockSite0", "ActiveTabID", String());
  Again->LoadWindowState(Desktop.Get());
  EXPECT_EQ(Again->DockTab()->TabIndex(), 0) << "the older key by caption, without regard to case";
  EXPECT_EQ(Again->DockInfoCount(), 3);

  // A position out of range or not a number puts the strip at the bottom.
  for (const char* Bad : {"9", "-1", "left"}) {
    Desktop->WriteString("DockSite0", "TabPosition", Bad);
    Again->SetDockTabPosition(tpTop);
    Again->LoadWindowState(Desktop.Get());
    EXPECT_EQ(Again->DockTab()->TabPosition(), tpBottom) << Bad;
    EXPECT_EQ(Again->DockTab()->Align(), alBottom) << Bad;
  }

  // A single client: the strip hides. No client list: the load aborts silently.
  Desktop->WriteString("DockSite0", "TabDockClients", "Beta");
  Again->LoadWindowState(Desktop.Get());
  EXPECT_EQ(Again->DockTab()->TabCount(), 1);
  EXPECT_FALSE(Again->DockTab()->Visible());
  Desktop->WriteString("DockSite0", "TabDockClients", String());
  EXPECT_THROW(Again->LoadWindowState(Desktop.Get()), EAbort);
  TObjectGuard<TMemIniFile> Empty(new TMemIniFile(String()));
  auto* Idle = CreateComponentOf<TTabDockHostForm>(Application());
  Idle->SetDeskSection("DockSite9");
  Idle->SaveWindowState(Empty.Get(), false);
  EXPECT_FALSE(Empty->SectionExists("DockSite9")) << "a host without clients saves nothing";
  Idle->Destroy();
  Again->Destroy();
}

TEST_F(DockHosts, ATabHostLoadedInABatchShowsItsActivePageWhenTheBatchEnds) {
  // The clients first: a host docks the windows the load has made so far.
  Register(THostedTool::StaticClass(), "Alpha");
  Register(THostedTool::StaticClass(), "Beta");
  Register(TTabDockHostForm::StaticClass(), "DockSite0");
  TObjectGuard<TMemIniFile> Desktop = DesktopOf("[DockSite0]\nCreate=1\nVisible=1\nLeft=1000\nTop=1000\n"
                                                "Width=2000\nHeight=3000\nTabDockClients=Alpha,Beta\n"
                                                "ActiveTabID=Alpha\n"
                                                "[Alpha]\nCreate=1\nVisible=1\nDocked=1\n"
                                                "[Beta]\nCreate=1\nVisible=1\nDocked=1\n");
  TIDEDesktopService::BeginUpdate();
  auto End = Finally([]() noexcept {
    if (TIDEDesktopService::IsLocked()) RunIgnoringExceptions([] { TIDEDesktopService::EndUpdate(); });
  });
  LoadDesktopFormClasses(Desktop.Get());
  auto* Host = dynamic_cast<TTabDockHostForm*>(Vars["DockSite0"]);
  ASSERT_NE(Host, nullptr);
  ASSERT_EQ(Host->DockInfoCount(), 2);
  EXPECT_EQ(Host->DockTab()->TabIndex(), 0);
  EXPECT_EQ(Host->ActivePage(), nullptr) << "a tab click waits while the host is in the batch";
  TIDEDesktopService::EndUpdate();
  TTabDockInfo* Alpha = Host->GetDockClientInfo(Vars["Alpha"]);
  ASSERT_NE(Alpha, nullptr);
  EXPECT_EQ(Host->ActivePage(), Alpha->TabSheet());
  EXPECT_TRUE(Alpha->TabSheet()->Visible());
  EXPECT_FALSE(Host->GetDockClientInfo(Vars["Beta"])->TabSheet()->Visible());
  EXPECT_EQ(Host->Caption(), "Untitled Window") << "the caption of the tab in front";
}

TEST_F(DockHosts, ADesktopOfTabAndJoinHostsComesBackOnOtherMonitors) {
  for (const char* S : {"Alpha", "Beta", "Gamma", "Delta"}) Register(TSectionTool::StaticClass(), S);
  Register(TTabDockHostForm::StaticClass(), "DockSite0");
  Register(TJoinDockForm::StaticClass(), "DockSite1");
  auto Make = [&](const char* S) {
    auto* W = MakeWindow<TSectionTool>(S);
    W->SetBounds(0, 0, 200, 200);
    W->Show();
    return W;
  };
  auto* Tabs = MakeWindow<TTabDockHostForm>("DockSite0");
  Tabs->SetBoundsRect(Rect(960, 104, 1440, 624));
  Tabs->Show();
  Tabs->ManualDockClient(Make("Alpha"), nullptr, alNone, false);
  Tabs->ManualDockClient(Make("Beta"), nullptr, alNone, false);
  Tabs->DockTab()->SetTabIndex(0);
  auto* Join = MakeWindow<TJoinDockForm>("DockSite1");
  Join->SetBoundsRect(Rect(192, 520, 1152, 1040));
  Join->Show();
  Join->ManualDockClient(Make("Gamma"), nullptr, alNone, false);
  Join->ManualDockClient(Make("Delta"), Vars["Gamma"], alRight, false);
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(String()));
  SaveDesktopFormClasses(Desktop.Get(), false);
  EXPECT_EQ(Desktop->ReadString("DockSite0", "TabDockClients", "?"), "Alpha,Beta");
  EXPECT_EQ(Desktop->ReadString("DockSite0", "ActiveTabID", "?"), "Alpha");
  EXPECT_EQ(Desktop->ReadString("DockSite0", "Left", "?"), "5000");
  EXPECT_EQ(Desktop->ReadString("DockSite0", "Width", "?"), "2500");
  EXPECT_EQ(Desktop->ReadString("DockSite1", "DockClients", "?"), "Gamma,Delta");
  EXPECT_EQ(Desktop->ReadString("DockSite1", "Top", "?"), "5000");
  EXPECT_EQ(Desktop->ReadString("Alpha", "Docked", "?"), "1");

  // Freed, and loaded in one batch on a larger primary with a second monitor to its left.
  for (auto& Entry : Vars)
    if (Entry.second && Exists(Entry.second)) Entry.second->Destroy();
  for (auto& Entry : Vars) Entry.second = nullptr;
  ProcessMessages();
  ASSERT_TRUE(HostDockFormList().empty());
  Screen()->SetMonitors({{Rect(-1280, 0, 0, 1024), Rect(-1280, 0, 0, 984), 96, false},
                         {Rect(0, 0, 2560, 1440), Rect(0, 0, 2560, 1400), 96, true}});
  TIDEDesktopService::BeginUpdate();
  LoadDesktopFormClasses(Desktop.Get());
  TIDEDesktopService::EndUpdate();
  ProcessMessages();
  auto* NewTabs = dynamic_cast<TTabDockHostForm*>(Vars["DockSite0"]);
  auto* NewJoin = dynamic_cast<TJoinDockForm*>(Vars["DockSite1"]);
  ASSERT_NE(NewTabs, nullptr);
  ASSERT_NE(NewJoin, nullptr);
  EXPECT_EQ(NewTabs->BoundsRect(), Rect(1280, 140, 1920, 840)) << "half across, a quarter wide, scaled";
  EXPECT_EQ(NewJoin->BoundsRect(), Rect(256, 700, 1536, 1400));
  EXPECT_EQ(TabTexts(NewTabs), (std::vector<String>{"Alpha", "Beta"}));
  EXPECT_EQ(NewTabs->DockTab()->TabIndex(), 0);
  EXPECT_EQ(NewTabs->ActivePage(), NewTabs->GetDockClientInfo(Vars["Alpha"])->TabSheet());
  EXPECT_EQ(NewTabs->Caption(), "Alpha");
  EXPECT_EQ(DockClients(NewJoin), (std::vector<TControl*>{Vars["Gamma"], Vars["Delta"]}));
  EXPECT_LT(Vars["Gamma"]->Left(), Vars["Delta"]->Left()) << "side by side as they were";
  EXPECT_EQ(Vars["Gamma"]->Top(), Vars["Delta"]->Top());
  EXPECT_EQ(NewJoin->Caption(), "Gamma, Delta");
  for (const char* S : {"DockSite0", "DockSite1"}) {
    EXPECT_TRUE(Vars[S]->Visible()) << S;
    ExpectOnAMonitor(Vars[S], S);
  }
}

TEST_F(DockHosts, ADialogCharacterGoesToTheClientThatHasTheFocus) {
  auto Box = [](TWinControl* Parent, const char* Caption) {
    auto* B = CreateComponentOf<TAccelBox>(Parent);
    B->SetParent(Parent);
    B->SetCaption(Caption);
    B->SetBounds(4, 4, 60, 20);
    return B;
  };
  THostedTool* A = Tool("A", Rect(100, 100, 300, 300));
  THostedTool* B = Tool("B", Rect(400, 100, 600, 300));
  THostedTool* Outside = Tool("Outside", Rect(900, 600, 1100, 800));
  TAccelBox* BoxA = Box(A, "&Run");
  TAccelBox* BoxB = Box(B, "&Run");
  auto* Join = CreateComponentOf<TJoinDockForm>(Application());
  Join->SetBoundsRect(Rect(100, 400, 700, 800));
  Join->Show();
  Join->ManualDockClient(A, nullptr, alNone, false);
  Join->ManualDockClient(B, A, alRight, false);
  EXPECT_EQ(Join->GetDialogCharParentClass(), TDockableForm::StaticClass());
  SetFocus(BoxB);
  EXPECT_EQ(SendMessage(Join, CM_DIALOGCHAR, 'r', 0), 1);
  EXPECT_EQ(BoxA->Taken, 0) << "only the client that has the focus is asked";
  EXPECT_EQ(BoxB->Taken, 1);
  EXPECT_EQ(SendMessage(Join, CM_DIALOGCHAR, 'x', 0), 0) << "nobody's accelerator";
  SetFocus(Outside);
  EXPECT_EQ(SendMessage(Join, CM_DIALOGCHAR, 'R', 0), 1);
  EXPECT_EQ(BoxA->Taken, 1) << "with the focus elsewhere the clients are asked in order";
  EXPECT_EQ(BoxB->Taken, 1) << "and the first that takes it ends the round";

  // A tab host asks its page area: only the client in front can take it.
  THostedTool* C = Tool("C", Rect(100, 100, 300, 300));
  THostedTool* D = Tool("D", Rect(400, 100, 600, 300));
  TAccelBox* BoxC = Box(C, "&Go");
  TAccelBox* BoxD = Box(D, "&Go");
  auto* Tabs = CreateComponentOf<TTabDockHostForm>(Application());
  Tabs->SetBoundsRect(Rect(800, 100, 1200, 500));
  Tabs->Show();
  Tabs->ManualDockClient(C, nullptr, alNone, false);
  Tabs->ManualDockClient(D, nullptr, alNone, false);
  EXPECT_EQ(SendMessage(Tabs, CM_DIALOGCHAR, 'g', 0), 1);
  EXPECT_EQ(BoxC->Taken, 0);
  EXPECT_EQ(BoxD->Taken, 1);
  Tabs->DockTab()->SetTabIndex(0);
  EXPECT_EQ(SendMessage(Tabs, CM_DIALOGCHAR, 'g', 0), 1);
  EXPECT_EQ(BoxC->Taken, 1);
}

TEST_F(DockHosts, JoinHostsKeepTheirClientsAndTheirTree) {
  THostedTool* Target = Tool("Target", Rect(100, 100, 451, 351));
  THostedTool* Dragged = Tool("Dragged", Rect(900, 500, 1100, 700));
  DropAt(Dragged, Point(275, 110));
  auto* Join = HostOf<TJoinDockForm>(Target);
  ASSERT_NE(Join, nullptr);
  EXPECT_EQ(Join->HostDockType(), dtJoin);
  EXPECT_EQ(Join->DragKind(), dkDrag);
  EXPECT_EQ(Join->DragMode(), dmManual);
  EXPECT_EQ(DockClients(Join), (std::vector<TControl*>{Target, Dragged}));
  Dragged->SetCaption("Dragged Pane");
  EXPECT_EQ(Join->Caption(), "Target Caption, Dragged Pane") << "the captions of the visible clients";
  EXPECT_EQ(Join->GetVisibleClientCount(), 2);

  Join->SetDeskSection("DockSite1");
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(String()));
  Join->SaveWindowState(Desktop.Get(), false);
  EXPECT_EQ(Desktop->ReadString("DockSite1", "DockClients", "?"), "Target,Dragged") << "in the order they docked";
  String Tree = Desktop->ReadString("DockSite1", "DockSiteData", String());
  EXPECT_FALSE(Tree.empty());
  TRect DraggedAt = Dragged->BoundsRect(), TargetAt = Target->BoundsRect();

  // Loaded into a new host, the clients come back with their places.
  for (auto* T : {Target, Dragged}) Loaded->AddObject(T->DeskSection(), T);
  auto* Again = CreateComponentOf<TJoinDockForm>(Application());
  Again->SetDeskSection("DockSite1");
  Again->SetBounds(Join->Left(), Join->Top(), Join->Width(), Join->Height());
  Again->LoadWindowState(Desktop.Get());
  EXPECT_EQ(HostDockSite(Target), Again);
  EXPECT_EQ(HostDockSite(Dragged), Again);
  Again->UnlockUpdates();
  EXPECT_EQ(Dragged->BoundsRect(), DraggedAt);
  EXPECT_EQ(Target->BoundsRect(), TargetAt);
  EXPECT_EQ(Again->ReloadDockedControl("dragged"), Dragged);
  ProcessMessages();
  EXPECT_EQ(HostDockFormList(), (std::vector<TBaseDockHostForm*>{Again})) << "the emptied host ended";

  // Hiding one of two clients ends the host too.
  Dragged->Hide();
  EXPECT_FALSE(Again->Visible() && Again->GetVisibleClientCount() == 0);
  ProcessMessages();
  EXPECT_TRUE(HostDockFormList().empty());
  EXPECT_EQ(HostDockSite(Target), nullptr);

  TObjectGuard<TMemIniFile> Bare(DesktopOf("[DockSite2]\nCreate=1\n").Release());
  auto* Lone = CreateComponentOf<TJoinDockForm>(Application());
  Lone->SetDeskSection("DockSite2");
  EXPECT_THROW(Lone->LoadWindowState(Bare.Get()), EAbort) << "no \"DockClients\"";
  Lone->Destroy();
}

TEST_F(DockHosts, TabHostsMergeAndHostsFollowTheirClients) {
  auto* First = CreateComponentOf<TTabDockHostForm>(Application());
  auto* Second = CreateComponentOf<TTabDockHostForm>(Application());
  THostedTool* A = Tool("A", Bounds(0, 0, 100, 100));
  THostedTool* B = Tool("B", Bounds(0, 0, 100, 100));
  THostedTool* C = Tool("C", Bounds(0, 0, 100, 100));
  THostedTool* D = Tool("D", Bounds(0, 0, 100, 100));
  First->ManualDockClient(A, nullptr, alNone, false);
  First->ManualDockClient(B, nullptr, alNone, false);
  Second->ManualDockClient(C, nullptr, alNone, false);
  Second->ManualDockClient(D, nullptr, alNone, false);
  ManualDock(Second, First);
  EXPECT_EQ(TabTexts(First), (std::vector<String>{"A Caption", "B Caption", "D Caption", "C Caption"}));
  EXPECT_EQ(Second->DockInfoCount(), 0);
  ProcessMessages();
  EXPECT_EQ(HostDockFormList(), (std::vector<TBaseDockHostForm*>{First})) << "the emptied host ended";

  // Stay on top follows the clients, up through the host's own host.
  auto* Outer = CreateComponentOf<TJoinDockForm>(Application());
  THostedTool* E = Tool("E", Bounds(0, 0, 100, 100));
  Outer->ManualDockClient(First, nullptr, alNone, false);
  Outer->ManualDockClient(E, nullptr, alLeft, false);
  First->Show();
  C->SetStayOnTop(true);
  EXPECT_EQ(First->FormStyle(), fsStayOnTop);
  EXPECT_EQ(Outer->FormStyle(), fsStayOnTop);
  C->SetStayOnTop(false);
  EXPECT_EQ(First->FormStyle(), fsNormal);
  EXPECT_EQ(Outer->FormStyle(), fsNormal);

  // Focus moving between clients tells the one that lost it.
  SendMessage(First, UMNewClientFocused, 0, reinterpret_cast<std::intptr_t>(A));
  SendMessage(First, UMNewClientFocused, 0, reinterpret_cast<std::intptr_t>(A));
  EXPECT_EQ(A->Deactivations, 0);
  EXPECT_EQ(First->LastFocusedClient(), A);
  A->SetParent(First);
  SendMessage(First, UMNewClientFocused, 0, reinterpret_cast<std::intptr_t>(B));
  EXPECT_EQ(A->Deactivations, 0) << "B stands in a page, not in the host itself";
  EXPECT_EQ(First->LastFocusedClient(), B);
  B->SetParent(First);
  SendMessage(First, UMNewClientFocused, 0, reinterpret_cast<std::intptr_t>(A));
  EXPECT_EQ(B->Deactivations, 1);
  B->SetEnabled(false);
  B->SetEnabled(true);
  EXPECT_EQ(B->Deactivations, 1) << "a change of its enablement is no deactivation";

  // Who may come and go: no source editor in a tab; no drop on a plain window.
  auto* Editor = CreateComponentOf<TEditWindow>(Application());
  TRect Influence;
  bool Can = true;
  TPoint OnStrip = First->DockTab()->ClientToScreen(Point(2, 2));
  First->GetSiteInfo(Editor, Influence, OnStrip, Can);
  EXPECT_FALSE(Can);
  First->GetSiteInfo(D, Influence, OnStrip, Can);
  EXPECT_TRUE(Can);
  First->GetSiteInfo(D, Influence, First->DockPanel()->ClientToScreen(Point(2, 2)), Can);
  EXPECT_FALSE(Can) << "with the strip showing, only over the strip";
  auto* Plain = CreateComponentOf<TForm>(Application());
  SetDockSite(Plain, true);
  EXPECT_FALSE(First->DoUnDock(Plain, D));
  EXPECT_TRUE(First->DoUnDock(nullptr, D));
  EXPECT_TRUE(First->DoUnDock(First, D));
  Plain->Destroy();
  Editor->Destroy();

  // Closing: hidden while clients remain or release is off; freed otherwise.
  TCloseAction Action = caNone;
  First->FormClose(First, Action);
  EXPECT_EQ(Action, caHide);
  First->UndockAllClientsAndSelf();
  EXPECT_TRUE(DockClients(First).empty());
  EXPECT_EQ(HostDockSite(First), nullptr) << "the host leaves its own host too";
  First->SetDontReleaseForm(true);
  ProcessMessages();
  EXPECT_EQ(HostDockFormList(), (std::vector<TBaseDockHostForm*>{First})) << "kept alive with no clients";
  First->Show();
  First->Close();
  EXPECT_FALSE(First->Visible()) << "closing hides a host kept alive";
  EXPECT_EQ(HostDockFormList(), (std::vector<TBaseDockHostForm*>{First}));
  EXPECT_EQ(TTabDockHostForm::GetClientCaption(First->DockPanel()), "Untitled Window");
  First->SetDontReleaseForm(false);
  First->Close();
  ProcessMessages();
  EXPECT_TRUE(HostDockFormList().empty()) << "an empty host is freed when it closes";
}


TEST_F(DockHosts, ADragOverTheStripPlacesTheTabWhereTheMouseIs) {
  auto* Host = CreateComponentOf<TTabDockHostForm>(Application());
  Host->SetBorderStyle(bsNone);
  Host->SetBounds(100, 100, 300, 200);
  Host->Show();
  THostedTool* A = Tool("A", Bounds(0, 0, 100, 100));
  THostedTool* B = Tool("B", Bounds(0, 0, 100, 100));
  THostedTool* C = Tool("C", Bounds(0, 0, 100, 100));
  for (auto* T : {A, B, C}) Host->ManualDockClient(T, nullptr, alNone, false);
  Host->DockTab()->SetTabIndex(0);
  ASSERT_TRUE(Host->DockTab()->Visible());
  // Three tabs of 100 pixels along the strip at the bottom.
  TPoint Strip = Host->DockTab()->ClientToScreen(Point(0, 2));
  THostedTool* Outside = Tool("Outside", Bounds(900, 500, 100, 100));
  {
    TDockDrag Drag(Outside);
    Drag.MoveTo(Point(Strip.X + 160, Strip.Y));
    ASSERT_EQ(Drag.DragObject()->DragTarget(), Host);
    EXPECT_TRUE(Drag.DragObject()->DockRect().IsEmpty()) << "shown as a tab, not as a frame";
    EXPECT_EQ(TabTexts(Host), (std::vector<String>{"A Caption", "B Caption", "Outside Caption", "C Caption"}))
        << "past the middle of tab 1";
    EXPECT_EQ(Host->DockTab()->TabIndex(), 2);
    Drag.MoveTo(Point(Strip.X + 2, Strip.Y));
    EXPECT_EQ(TabTexts(Host), (std::vector<String>{"Outside Caption", "A Caption", "B Caption", "C Caption"}));
    // Away again: the order and the selected tab come back.
    Drag.MoveTo(Point(1500, 900));
    EXPECT_EQ(TabTexts(Host), (std::vector<String>{"A Caption", "B Caption", "C Caption"}));
    EXPECT_EQ(Host->DockTab()->TabIndex(), 0);
    EXPECT_EQ(Host->DockInfoCount(), 3);
    Drag.Cancel();
  }
  // Dropped on the strip, it stays at the tab it was shown on.
  DropAt(Outside, Point(Strip.X + 160, Strip.Y));
  EXPECT_EQ(HostDockSite(Outside), Host);
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"A Caption", "B Caption", "Outside Caption", "C Caption"}));
  EXPECT_EQ(TabIndexes(Host), (std::vector<int>{0, 1, 3, 2}));
  EXPECT_EQ(Host->Caption(), "Outside Caption");
  EXPECT_EQ(Outside->Parent(), Host->ActivePage());

  // A client's own tab dragged along the strip and dropped there only moves the tab.
  DropAt(A, Point(Strip.X + 299, Strip.Y));
  EXPECT_EQ(HostDockSite(A), Host);
  EXPECT_EQ(TabTexts(Host), (std::vector<String>{"B Caption", "Outside Caption", "C Caption", "A Caption"}));
  EXPECT_EQ(Host->DockInfoCount(), 4);
  EXPECT_EQ(A->Align(), alClient);

  // The source editor never becomes a tab.
  auto* Editor = CreateComponentOf<TEditWindow>(Application());
  Editor->SetBorderStyle(bsNone);
  Editor->SetBoundsRect(Bounds(900, 100, 100, 100));
  Editor->Show();
  {
    TDockDrag Drag(Editor);
    Drag.MoveTo(Point(Strip.X + 10, Strip.Y));
    EXPECT_FALSE(Drag.Accepted());
    EXPECT_EQ(Host->DockTab()->TabCount(), 4);
    Drag.Cancel();
  }
  Editor->Destroy();
  Host->Destroy();
}

TEST_F(DockHosts, ATabDraggedOffTheStripTakesItsClientOut) {
  auto* Host = CreateComponentOf<TTabDockHostForm>(Application());
  Host->SetBorderStyle(bsNone);
  Host->SetBounds(100, 100, 300, 200);
  Host->Show();
  THostedTool* A = Tool("A", Bounds(0, 0, 120, 80));
  THostedTool* B = Tool("B", Bounds(0, 0, 120, 80));
  Host->ManualDockClient(A, nullptr, alNone, false);
  Host->ManualDockClient(B, nullptr, alNone, false);
  ASSERT_EQ(Host->DockTab()->TabIndex(), 1);

  // A right button only selects; a small move is no drag.
  Host->DockTabMouseDown(mbRight, Point(10, 5));
  EXPECT_EQ(Host->DockTab()->TabIndex(), 0);
  Host->DockTabMouseMove(Point(60, 5));
  EXPECT_EQ(Host->TabDrag(), nullptr);
  Host->DockTabMouseDown(mbLeft, Point(160, 5));
  EXPECT_EQ(Host->DockTab()->TabIndex(), 1);
  Host->DockTabMouseMove(Point(164, 1));
  EXPECT_EQ(Host->TabDrag(), nullptr) << "within the threshold of 5";
  Host->DockTabMouseMove(Point(165, 5));
  ASSERT_NE(Host->TabDrag(), nullptr);
  EXPECT_EQ(Host->TabDrag()->DragObject()->Control(), B);

  TPoint Away = Host->DockTab()->ScreenToClient(Point(1500, 800));
  Host->DockTabMouseUp(Away);
  EXPECT_EQ(Host->TabDrag(), nullptr);
  EXPECT_EQ(HostDockSite(B), nullptr) << "dropped in the open, the client floats";
  ProcessMessages();
  EXPECT_TRUE(HostDockFormList().empty());
  EXPECT_EQ(A->BoundsRect(), Rect(100, 100, 220, 180));
}

} // namespace
} // namespace formkit::desktoptest
