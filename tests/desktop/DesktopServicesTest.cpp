//===- tests/desktop/DesktopServicesTest.cpp - Registry, docking, windows ===//
#include "tests/desktop/DesktopTestWindows.h"

#include "desktop/BaseIDEFrame.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"

using namespace formkit;
using namespace formkit::desktoptest;

namespace {

using DesktopServices = DesktopTest;


std::vector<String>& ProcLog() {
  static std::vector<String> Log;
  return Log;
}
void LoadA(TCustomIniFile* D) { ProcLog().push_back("loadA:" + D->ReadString("A", "K", "")); }
void SaveA(TCustomIniFile* D, bool P) {
  ProcLog().push_back(P ? "saveA:project" : "saveA");
  D->WriteString("A", "K", "v");
}
void LoadB(TCustomIniFile*) { ProcLog().push_back("loadB"); }
void SaveB(TCustomIniFile*, bool) { ProcLog().push_back("saveB"); }

TEST_F(DesktopServices, RegistryCreatesHidesAndForgetsWindows) {
  Register(TSectionAwareWindow::StaticClass(), "Aware");
  Register(TPaneWindow::StaticClass(), "Shown");
  RegisterDesktopFormClass(TPaneWindow::StaticClass(), "Second", "SecondInstance");
  EXPECT_EQ(GetInstanceName(TPaneWindow::StaticClass(), ""), "Shown") << "the first registration";
  EXPECT_EQ(GetInstanceName(TPaneWindow::StaticClass(), "Second"), "SecondInstance");
  EXPECT_EQ(GetInstanceName(TPaneWindow::StaticClass(), "Nowhere"), "");
  EXPECT_EQ(GetInstanceName(TDesktopForm::StaticClass(), ""), "") << "exactly that class";

  auto* Shown = MakeWindow<TPaneWindow>("Shown");
  Shown->Show();
  auto Desktop = DesktopOf("[Aware]\nCreate=1\nVisible=0\n[Shown]\nCreate=0\n[Second]\nCreate=1\n");
  LoadDesktopFormClasses(Desktop.Get());
  auto* Aware = dynamic_cast<TSectionAwareWindow*>(Vars["Aware"]);
  ASSERT_NE(Aware, nullptr);
  EXPECT_EQ(Aware->Owner(), Application());
  EXPECT_EQ(Aware->Told, (std::vector<String>{"Aware"})) << "told its section as soon as it is made";
  EXPECT_FALSE(Aware->Visible());
  EXPECT_FALSE(Shown->Visible()) << "a window the desktop does not create is hidden";
  EXPECT_EQ(Loaded->CommaText(), "Aware,Shown") << "the second registration has no host variable";
  UnregisterDesktopFormClass(TPaneWindow::StaticClass());
  EXPECT_EQ(GetInstanceName(TPaneWindow::StaticClass(), "Second"), "");

  // A window that goes clears the host's variable and its entry in the load's list.
  Aware->Destroy();
  EXPECT_EQ(Vars["Aware"], nullptr);
  EXPECT_EQ(Loaded->CommaText(), "Shown");
}

TEST_F(DesktopServices, DesktopProceduresRunOnceEachInOrder) {
  ProcLog().clear();
  RegisterDesktopProcs(LoadA, SaveA);
  RegisterDesktopProcs(LoadB, nullptr);
  RegisterDesktopProcs(LoadA, SaveA);
  RegisterDesktopProcs(nullptr, SaveB);
  auto Unregister = Finally([]() noexcept {
    UnregisterDesktopProcs(LoadA, SaveA);
    UnregisterDesktopProcs(LoadB, nullptr);
    UnregisterDesktopProcs(nullptr, SaveB);
  });
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile);
  DoDesktopSaveProcs(Desktop.Get(), true);
  DoDesktopLoadProcs(Desktop.Get());
  EXPECT_EQ(ProcLog(), (std::vector<String>{"saveA:project", "saveB", "loadA:v", "loadB"}));
  // A freed entry is taken again, but the order is that of registration.
  UnregisterDesktopProcs(LoadA, SaveA);
  RegisterDesktopProcs(LoadA, nullptr);
  ProcLog().clear();
  DoDesktopLoadProcs(Desktop.Get());
  EXPECT_EQ(ProcLog(), (std::vector<String>{"loadB", "loadA:v"}));
  UnregisterDesktopProcs(LoadA, nullptr);
}

TEST_F(DesktopServices, DockClientsFollowTheFile) {
  Register(THostWindow::StaticClass(), "Host");
  auto* Host = MakeWindow<THostWindow>("Host");
  auto* A = MakeWindow<TPaneWindow>("A");
  auto* B = MakeWindow<TPaneWindow>("B");
  auto* C = MakeWindow<TPaneWindow>("C");
  ManualDock(A, Host);
  ManualDock(B, Host);
  TObjectGuard<TMemIniFile> Saved(new TMemIniFile);
  Host->SaveWindowState(Saved.Get(), false);
  EXPECT_EQ(Saved->ReadString("Host", "DockClients", ""), "A,B");
  EXPECT_EQ(Saved->ReadString("Host", "DockSiteData", ""), "417C42") << "the arrangement as hexadecimal text";

  for (TDesktopForm* F : {A, B, C}) Loaded->AddObject(F->DeskSection(), F);
  auto Desktop = DesktopOf("[Host]\nDockClients=C,A,Ghost\nDockSiteData=43\n[C]\nCreate=1\nVisible=1\nDocked=1\n");
  EXPECT_TRUE(Host->LoadDockClients(Desktop.Get(), "DockClients", Host));
  EXPECT_EQ(DockClients(Host), (std::vector<TControl*>{A, C})) << "a client the file does not name is undocked";
  EXPECT_EQ(HostDockSite(B), nullptr);
  EXPECT_EQ(B->Parent(), nullptr);
  EXPECT_TRUE(A->DockingTouched());
  EXPECT_TRUE(C->DockingTouched());
  EXPECT_TRUE(B->Locked() && C->Locked()) << "all that moved wait for the batch";
  Host->LoadDockStream(Desktop.Get(), "DockSiteData", Host);
  EXPECT_FALSE(A->DockingTouched());
  EXPECT_TRUE(C->LoadedFromDesktop()) << "the host loads its clients";
  EXPECT_TRUE(C->Visible());
  EXPECT_EQ(Host->Manager->Loaded, "C");
  EXPECT_FALSE(Host->LoadDockClients(Desktop.Get(), "Nothing", Host));
  EXPECT_EQ(DockClients(Host).size(), 2u) << "no list moves nobody";
  TIDEDesktopService::EndUpdate();

  // A client whose load fails is reported, and the others load.
  auto* Broken = MakeWindow<TBrokenWindow>("Broken");
  Broken->SetName("BrokenClient");
  ManualDock(Broken, Host);
  Loaded->AddObject("Broken", Broken);
  auto Failing = DesktopOf("[Host]\nDockClients=Broken,A\nDockSiteData=4241\n[A]\nCreate=1\nVisible=0\n",
                           Temp.File("failing.dsk"));
  ASSERT_TRUE(Host->LoadDockClients(Failing.Get(), "DockClients", Host));
  Host->LoadDockStream(Failing.Get(), "DockSiteData", Host);
  EXPECT_EQ(Application()->ShownExceptions(),
            (std::vector<String>{"Loading the desktop from \"" + Temp.File("failing.dsk") +
                                 "\" for dock host window \"BrokenClient\" failed with message: \r\n\r\n"
                                 "\"EReadError: bad section\""}));
  EXPECT_FALSE(Broken->DockingTouched());
  EXPECT_TRUE(A->LoadedFromDesktop());
  EXPECT_EQ(Host->Manager->Loaded, "BA");
  TIDEDesktopService::EndUpdate();
}

TEST_F(DesktopServices, DrawingFreezesOnceAndThawsByMessage) {
  auto* W = MakeWindow<TPaneWindow>("W");
  W->Show();
  auto* Shown = CreateComponentOf<TPanel>(W);
  Shown->SetParent(W);
  auto* Hidden = CreateComponentOf<TPanel>(W);
  Hidden->SetParent(W);
  Hidden->Hide();
  auto* Tool = MakeWindow<TPaneWindow>("Tool");
  Tool->SetBorderStyle(bsToolWindow);
  Tool->SetParent(W);
  Tool->Show();
  W->LockDrawing();
  EXPECT_FALSE(RedrawEnabled(Shown));
  EXPECT_TRUE(RedrawEnabled(Hidden));
  EXPECT_TRUE(RedrawEnabled(Tool)) << "tool windows keep drawing";
  W->LockDrawing();
  EXPECT_EQ(W->DrawingLockCount(), 2) << "a second lock only counts";
  W->UnlockDrawing();
  EXPECT_EQ(PendingMessageCount(W), 0);
  W->UnlockDrawing();
  W->UnlockDrawing();
  EXPECT_EQ(W->DrawingLockCount(), 0);
  EXPECT_EQ(PendingMessageCount(W), 1) << "one message, posted at the last unlock";
  EXPECT_TRUE(W->UnlockMessagePosted());
  EXPECT_FALSE(RedrawEnabled(Shown)) << "switched back on only by the message";
  int Before = InvalidationCount(Shown);
  ProcessMessages();
  EXPECT_TRUE(RedrawEnabled(Shown));
  EXPECT_EQ(InvalidationCount(Shown), Before + 1);
  EXPECT_FALSE(W->UnlockMessagePosted());

  // The service freezes every visible top-level desktop window.
  auto* Other = MakeWindow<TPaneWindow>("Other");
  Other->Show();
  auto* Invisible = MakeWindow<TPaneWindow>("Invisible");
  TIDEDesktopService::UnLockDrawing();
  EXPECT_FALSE(TIDEDesktopService::IsDrawingLocked());
  TIDEDesktopService::LockDrawing();
  EXPECT_TRUE(TIDEDesktopService::IsDrawingLocked());
  EXPECT_EQ(W->DrawingLockCount(), 1);
  EXPECT_EQ(Other->DrawingLockCount(), 1);
  EXPECT_EQ(Invisible->DrawingLockCount(), 0);
  EXPECT_EQ(Tool->DrawingLockCount(), 0) << "a window with a parent is not top-level";
  TIDEDesktopService::UnLockDrawing();
  EXPECT_EQ(Other->DrawingLockCount(), 0);
  EXPECT_TRUE(Other->UnlockMessagePosted());
  ProcessMessages();
}

/// A frame that takes the edits of the window it stands in.
class TEditFrame : public TBaseFrame {
  FK_CLASS(TEditFrame, TBaseFrame)
public:
  bool EditAction(TEditAction A) override {
    Actions.push_back(A);
    return true;
  }
  TEditState GetEditState() override { return {esCanCopy}; }
  std::vector<TEditAction> Actions;
};
FK_IMPLEMENT(TEditFrame, "DesktopTest") {}

TEST_F(DesktopServices, WindowsShownFocusedAndFound) {
  auto* Host = MakeWindow<THostWindow>("Host");
  auto* Client = MakeWindow<TPaneWindow>("Client");
  ManualDock(Client, Host);
  auto* Button = CreateComponentOf<TButton>(Client);
  Button->SetParent(Client);
  Button->SetTabStop(true);
  auto* Frame = CreateComponentOf<TEditFrame>(Client);
  Frame->SetParent(Client);
  auto* Edit = CreateComponentOf<TEdit>(Client);
  Edit->SetParent(Frame);

  // A docked window is shown in its host, and the host with it.
  EXPECT_EQ(ShowDockableForm(Client), Host);
  EXPECT_TRUE(Client->Visible());
  EXPECT_TRUE(Host->Visible());
  Host->Hide();
  Client->Hide();
  EXPECT_EQ(FocusWindow(Client), Host);
  EXPECT_TRUE(Host->Visible());
  EXPECT_EQ(GetFocus(), Button) << "the first tab stop of a window with a parent";
  EXPECT_FALSE(TIDEDesktopService::IsDrawingLocked()) << "frozen only for the duration";
  EXPECT_EQ(GetTopWindow(), Host);
  EXPECT_EQ(GetImmediateDesktopForm(Host), Client);
  EXPECT_EQ(FocusWindow(nullptr), nullptr);

  auto* Floating = MakeWindow<TPaneWindow>("Floating");
  Floating->Show();
  Floating->SetWindowState(wsMinimized);
  EXPECT_EQ(FocusWindow(Floating), Floating);
  EXPECT_EQ(Floating->WindowState(), wsNormal) << "restored";
  EXPECT_EQ(GetFocus(), Floating);
  EXPECT_EQ(GetImmediateDesktopForm(Floating), Floating);
  Floating->Hide();
  Client->Hide();
  Host->Hide();
  EXPECT_EQ(GetTopWindow(), Floating) << "the last window that had the focus";

  // Edits go to the innermost frame or desktop window around the focus.
  SetFocus(Edit);
  EXPECT_TRUE(Host->EditAction(eaCopy)) << "the client handles it through its frame";
  EXPECT_EQ(Frame->Actions, (std::vector<TEditAction>{eaCopy}));
  EXPECT_EQ(Host->GetEditState(), TEditState({esCanCopy}));
  SetFocus(Button);
  EXPECT_FALSE(Client->EditAction(eaPaste)) << "nobody inside the client takes it";
  EXPECT_EQ(Client->GetEditState().Mask(), 63u);
  EXPECT_EQ(Frame->GetEditState(), TEditState({esCanCopy}));
  Edit->Destroy();
  EXPECT_EQ(GetFocus(), Button);
}

TEST_F(DesktopServices, DesignAndDefaultFormsDisabledDesktopAndOrigin) {
  struct TSink : TObject {
    std::vector<String> Log;
    void Hidden(TObject*) { Log.push_back("hidden"); }
    void Shown(TObject*) { Log.push_back("shown"); }
  } Sink;
  RegisterDesignForm(TSectionAwareWindow::StaticClass());
  HideDesignFormsEvent()->Add(TNotifyEvent::Bind<&TSink::Hidden>(&Sink));
  ShowDesignFormsEvent()->Add(TNotifyEvent::Bind<&TSink::Shown>(&Sink));
  auto* Top = MakeWindow<TSectionAwareWindow>("Top");
  Top->Show();
  auto* Holder = MakeWindow<TPaneWindow>("Holder");
  Holder->Show();
  auto* HiddenPanel = CreateComponentOf<TPanel>(Holder);
  HiddenPanel->SetParent(Holder);
  HiddenPanel->Hide();
  auto* Nested = MakeWindow<TSectionAwareWindow>("Nested");
  Nested->SetParent(HiddenPanel);
  Nested->Show();
  auto* Plain = MakeWindow<TPaneWindow>("Plain");
  Plain->Show();
  Top->SetPosition(poScreenCenter);
  HideDesignForms();
  EXPECT_FALSE(Top->Visible());
  EXPECT_EQ(Top->DefaultMonitor(), dmDesktop);
  EXPECT_EQ(Nested->DefaultMonitor(), dmActiveForm);
  EXPECT_TRUE(Nested->Visible()) << "a form under a hidden parent is left alone";
  EXPECT_TRUE(Plain->Visible());
  ShowDesignForms();
  EXPECT_TRUE(Top->Visible());
  EXPECT_EQ(Top->DefaultMonitor(), dmActiveForm);
  EXPECT_EQ(Sink.Log, (std::vector<String>{"hidden", "shown"}));
  HideDesignForms();
  Top->Destroy();
  ShowDesignForms(); // the hidden form went meanwhile
  UnregisterDesignForm(TSectionAwareWindow::StaticClass());

  RegisterDefaultForm(TSectionAwareWindow::StaticClass());
  Nested->Hide();
  ShowDefaultForms();
  EXPECT_TRUE(Nested->Visible());
  UnregisterDefaultForm(TSectionAwareWindow::StaticClass());

  // The desktop is disabled once, with the hourglass, and enabled at the last release.
  TDisabledDesktopList List = DisableDesktop();
  ASSERT_NE(List, nullptr);
  EXPECT_FALSE(Holder->Enabled());
  EXPECT_EQ(Screen()->Cursor(), crHourGlass);
  TDisabledDesktopList Nest = DisableDesktop();
  EXPECT_EQ(Nest, nullptr);
  EnableDesktop(std::move(Nest));
  EXPECT_FALSE(Holder->Enabled());
  EnableDesktop(std::move(List));
  EXPECT_TRUE(Holder->Enabled());
  EXPECT_EQ(Screen()->Cursor(), crDefault);

  // The workspace starts right of the left reference and below the top one.
  EXPECT_EQ(GetWorkspaceOrigin(), Point(0, 0));
  auto* LeftBar = MakeWindow<TPaneWindow>("LeftBar");
  LeftBar->SetBounds(0, 0, 300, 1040);
  auto* TopBar = MakeWindow<TPaneWindow>("TopBar");
  TopBar->SetBounds(300, 0, 1620, 150);
  auto* Strip = CreateComponentOf<TPanel>(TopBar);
  Strip->SetParent(TopBar);
  Strip->SetBounds(0, 0, 1600, 60);
  WorkspaceReferenceLeft = LeftBar;
  WorkspaceReferenceTop = Strip;
  auto Clear = Finally([]() noexcept {
    WorkspaceReferenceLeft = nullptr;
    WorkspaceReferenceTop = nullptr;
  });
  EXPECT_EQ(GetWorkspaceOrigin(), Point(300, 91));
  TopBar->SetTop(600);
  EXPECT_EQ(GetWorkspaceOrigin(), Point(300, 10)) << "a top reference in the lower half";
  LeftBar->SetWidth(1200);
  EXPECT_EQ(GetWorkspaceOrigin(), Point(308, 10)) << "a left reference past the middle";
}

/// A window that holds its position at run time instead of reading it.
class TRuntimeWindow : public TDesktopForm {
  FK_CLASS(TRuntimeWindow, TDesktopForm)
public:
  TDeskRuntimeInfo GetDeskRuntimeInfo() override { return Info; }
  TDeskRuntimeInfo Info;
};
FK_IMPLEMENT(TRuntimeWindow, "DesktopTest") {}

TEST_F(DesktopServices, RuntimeInfoToolBarsAndTheParentsResolution) {
  auto* Source = MakeWindow<TPaneWindow>("Source");
  Source->SetBounds(192, 104, 960, 520);
  TDeskRuntimeInfo Info;
  EXPECT_FALSE(Info.Valid);
  EXPECT_EQ(Info.WindowState, wsMaximized) << "a cleared record";
  Source->SaveWindowRuntimeInfo(Info);
  EXPECT_TRUE(Info.Valid);
  EXPECT_EQ(std::vector<int>({Info.Left, Info.Top, Info.Width, Info.Height}), std::vector<int>({1000, 1000, 5000, 5000}));
  EXPECT_EQ(Info.WindowState, wsNormal);
  auto* Held = MakeWindow<TRuntimeWindow>("Held");
  Held->Info = Info;
  Held->Info.WindowState = wsMaximized;
  auto Desktop = DesktopOf("[Held]\nPercentageSizes=1\nCreate=1\nVisible=1\nLeft=0\nTop=0\nWidth=1\nHeight=1\n");
  Held->LoadWindowState(Desktop.Get());
  EXPECT_EQ(Held->WindowState(), wsMaximized) << "the record wins over the file";
  EXPECT_EQ(Held->RestoredBounds(), Rect(192, 104, 1152, 624));
  Held->ZoomWindow();
  EXPECT_EQ(Held->BoundsRect(), Rect(192, 104, 1152, 624));

  // Captions on tool bar buttons, at twice the default resolution.
  auto* Bar = CreateComponentOf<TToolBar>(Source);
  Bar->SetParent(Source);
  Source->ScaleForPPI(192);
  SetShowCaptionsToolBar(Source, Bar, true);
  EXPECT_TRUE(Bar->ShowCaptions());
  EXPECT_EQ(Bar->ButtonHeight(), 49);
  EXPECT_EQ(Bar->ButtonWidth(), 112);
  EXPECT_EQ(Bar->Height(), 57);
  EXPECT_FALSE(Bar->ShowHint());
  Bar->SetButtonHeight(60);
  SetShowCaptionsToolBar(Source, Bar, true);
  EXPECT_EQ(Bar->ButtonHeight(), 60) << "no change when the setting is there";
  SetShowCaptionsToolBar(Source, Bar, false);
  EXPECT_EQ(std::vector<int>({Bar->ButtonHeight(), Bar->ButtonWidth(), Bar->Height()}), std::vector<int>({22, 23, 30}));
  EXPECT_TRUE(Bar->ShowHint());
  EXPECT_THROW(Bar->SetButtonWidth(0), EInvalidOperation);

  // A window inside a form of another resolution is told the parent's.
  auto* Host = MakeWindow<THostWindow>("Host");
  auto* Client = MakeWindow<TPaneWindow>("Client");
  Client->SetBounds(0, 0, 300, 200);
  Client->ScaleForPPI(144);
  int W = Client->Width(), H = Client->Height();
  ManualDock(Client, Host);
  Client->LoadWindowState(Desktop.Get());
  EXPECT_EQ(Client->CurrentPPI(), 96);
  EXPECT_EQ(Point(Client->Width(), Client->Height()), Point(MulDiv(W, 96, 144), MulDiv(H, 96, 144)));
}

} // namespace
