//===- host/DesktopRender.cpp - Pictures of a saved desktop layout --------===//
#include "host/DesktopRender.h"

#include "desktop/DockHostForms.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnDockTree.h"
#include "frameworks/kiln/KilnMessages.h"
#include "frameworks/kiln/KilnSplitters.h"
#include "host/FormRender.h"
#include "host/RenderCanvas.h"
#include "platform/IniFiles.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <map>
#include <ostream>
#include <utility>

namespace formkit {

FK_RESOURCESTRING(sDesktopUnknownOption,
                  "Unknown option '%s' of 'formkit desktop render'. Try 'formkit desktop --help'.");
FK_RESOURCESTRING(sDesktopMissingValue, "'formkit desktop render %s' needs a value. Try 'formkit desktop --help'.");
FK_RESOURCESTRING(sDesktopMissingArguments, "'formkit desktop render' needs FILE OUT. Try 'formkit desktop --help'.");

namespace {

//===----------------------------------------------------------------------===//
// Monitor sets
//===----------------------------------------------------------------------===//

/// Reads a monitor set left to right.
class TMonitorSetReader {
public:
  explicit TMonitorSetReader(const String& Text) : FText(Text) {}

  std::vector<TMonitorInfo> Read() {
    std::vector<TMonitorInfo> Monitors;
    do Monitors.push_back(ReadMonitor());
    while (Take(','));
    if (FPos != FText.size()) Fail("unexpected '" + FText.substr(FPos, 1) + "'");
    int Primaries =
        static_cast<int>(std::count_if(Monitors.begin(), Monitors.end(), [](auto& M) { return M.Primary; }));
    if (Primaries > 1) Fail("more than one monitor is marked primary");
    if (Primaries == 0) Monitors.front().Primary = true;
    return Monitors;
  }

private:
  TMonitorInfo ReadMonitor() {
    int Width = ReadNumber("a width");
    if (!Take('x') && !Take('X')) Fail("a size is WIDTHxHEIGHT");
    int Height = ReadNumber("a height");
    TPoint Origin;
    if (Take('@')) {
      Origin.X = ReadNumber("a left edge", true);
      if (!Take(',')) Fail("a position is LEFT,TOP");
      Origin.Y = ReadNumber("a top edge", true);
    }
    int Taskbar = DefaultTaskbarHeight;
    if (Take('/')) Taskbar = ReadNumber("a task bar height");
    TMonitorInfo M;
    if (Take(':')) M.PixelsPerInch = ReadNumber("pixels per inch");
    M.Primary = Take('*');
    if (Width < 1 || Height < 1)
      Fail("a monitor of " + std::to_string(Width) + "x" + std::to_string(Height) + " has no area");
    if (Taskbar >= Height) Fail("a task bar of " + std::to_string(Taskbar) + " leaves no work area");
    if (M.PixelsPerInch < 1) Fail("pixels per inch must be 1 or more");
    M.BoundsRect = Bounds(Origin.X, Origin.Y, Width, Height);
    M.WorkareaRect = Bounds(Origin.X, Origin.Y, Width, Height - Taskbar);
    return M;
  }

  int ReadNumber(const String& What, bool Signed = false) {
    std::size_t Start = FPos;
    if (Signed && FPos < FText.size() && FText[FPos] == '-') ++FPos;
    std::size_t Digits = FPos;
    while (FPos < FText.size() && FText[FPos] >= '0' && FText[FPos] <= '9') ++FPos;
    if (FPos == Digits) Fail(What + " is missing");
    if (FPos - Digits > 6) Fail(What + " is too large");
    return std::stoi(FText.substr(Start, FPos - Start));
  }

  bool Take(char C) {
    if (FPos >= FText.size() || FText[FPos] != C) return false;
    ++FPos;
    return true;
  }

  [[noreturn]] void Fail(const String& Why) const { throw EDesktopUsageError(sDesktopBadMonitors, FText, Why); }

  const String& FText;
  std::size_t FPos = 0;
};

std::vector<TMonitorInfo> CurrentMonitors() {
  std::vector<TMonitorInfo> Monitors;
  for (int I = 0; I < Screen()->MonitorCount(); ++I) {
    TMonitor* M = Screen()->Monitors(I);
    Monitors.push_back({M->BoundsRect(), M->WorkareaRect(), M->PixelsPerInch(), M->Primary()});
  }
  return Monitors;
}

//===----------------------------------------------------------------------===//
// The windows a desktop names
//===----------------------------------------------------------------------===//

/// Names a window after its section, when the section is an identifier nobody else of
/// the application uses: a join host's saved tree finds its clients by name.
void NameAfterSection(TDesktopForm* Form, const String& ASection) {
  if (IsValidIdent(ASection) && !Application()->FindComponent(ASection)) Form->SetName(ASection);
}

/// A tool window of the desktop, standing for whatever window its section saves.
class TDesktopPreviewWindow : public TDockableForm, public IDesktopFormCreator {
  FK_CLASS(TDesktopPreviewWindow, TDockableForm)
  FK_INTERFACES(IDesktopFormCreator)
public:
  void SetDeskSection(const String& ASection) override {
    TDockableForm::SetDeskSection(ASection);
    NameAfterSection(this, ASection);
    SetCaption(ASection);
  }
};

/// A tab host made for a section that lists "TabDockClients".
class TDesktopPreviewTabHost : public TTabDockHostForm, public IDesktopFormCreator {
  FK_CLASS(TDesktopPreviewTabHost, TTabDockHostForm)
  FK_INTERFACES(IDesktopFormCreator)
public:
  void SetDeskSection(const String& ASection) override {
    TTabDockHostForm::SetDeskSection(ASection);
    NameAfterSection(this, ASection);
  }
};

/// A join host made for a section that lists "DockClients".
class TDesktopPreviewJoinHost : public TJoinDockForm, public IDesktopFormCreator {
  FK_CLASS(TDesktopPreviewJoinHost, TJoinDockForm)
  FK_INTERFACES(IDesktopFormCreator)
public:
  void SetDeskSection(const String& ASection) override {
    TJoinDockForm::SetDeskSection(ASection);
    NameAfterSection(this, ASection);
  }
};

} // namespace

FK_IMPLEMENT(TDesktopPreviewWindow, "DesktopRender") {}
FK_IMPLEMENT(TDesktopPreviewTabHost, "DesktopRender") {}
FK_IMPLEMENT(TDesktopPreviewJoinHost, "DesktopRender") {}

namespace {

constexpr const char* KeyCreate = "Create";
constexpr const char* KeyTabDockClients = "TabDockClients";
constexpr const char* KeyDockClients = "DockClients";

/// One window section of a desktop and the class that stands for it.
struct TDesktopSection {
  String Name;
  TClass Class;
  /// The sections it docks, for a host.
  std::vector<String> Clients;
};

/// The window sections of `Desktop`: plain windows in file order, then the hosts, each
/// after the hosts it docks (file order where they form a ring).
std::vector<TDesktopSection> WindowSections(TCustomIniFile* Desktop) {
  TObjectGuard<TStringList> Names(new TStringList);
  Desktop->ReadSections(Names.Get());
  std::vector<TDesktopSection> Plain, Hosts;
  for (int I = 0; I < Names->Count(); ++I) {
    String Name = Names->Get(I);
    if (!Desktop->ValueExists(Name, KeyCreate)) continue;
    if (Desktop->ValueExists(Name, KeyTabDockClients))
      Hosts.push_back({Name, TDesktopPreviewTabHost::StaticClass(),
                       SplitAtCommas(Desktop->ReadString(Name, KeyTabDockClients, String()))});
    else if (Desktop->ValueExists(Name, KeyDockClients))
      Hosts.push_back({Name, TDesktopPreviewJoinHost::StaticClass(),
                       SplitAtCommas(Desktop->ReadString(Name, KeyDockClients, String()))});
    else
      Plain.push_back({Name, TDesktopPreviewWindow::StaticClass(), {}});
  }
  auto IsPendingHost = [&](const String& Name) {
    return std::any_of(Hosts.begin(), Hosts.end(), [&](const TDesktopSection& H) { return SameText(H.Name, Name); });
  };
  while (!Hosts.empty()) {
    auto Ready = std::find_if(Hosts.begin(), Hosts.end(), [&](const TDesktopSection& H) {
      return std::none_of(H.Clients.begin(), H.Clients.end(), IsPendingHost);
    });
    if (Ready == Hosts.end()) Ready = Hosts.begin();
    Plain.push_back(std::move(*Ready));
    Hosts.erase(Ready);
  }
  return Plain;
}

/// Raises for a desktop file that cannot be read or is no text.
void CheckDesktopFile(const String& FileName) {
  std::error_code Ec;
  if (std::filesystem::is_directory(FileName, Ec))
    throw ERenderError(sDesktopCannotRead, FileName, String(std::strerror(EISDIR)));
  std::ifstream In(FileName, std::ios::binary);
  if (!In) throw ERenderError(sDesktopCannotRead, FileName, String(std::strerror(errno)));
  String Text((std::istreambuf_iterator<char>(In)), std::istreambuf_iterator<char>());
  if (In.bad()) throw ERenderError(sDesktopCannotRead, FileName, String(std::strerror(errno)));
  if (Text.find('\0') != String::npos) throw ERenderError(sDesktopNotADesktop, FileName, String("it is not text"));
}

/// A desktop loaded onto a set of monitors, as the environment loads one: the framework
/// and the desktop started, a class registered for each window section, the windows
/// created and placed in one batch. What it changed of the screen and of the host's
/// variables is given back when it goes, and the windows are freed.
class TDesktopLoad {
public:
  explicit TDesktopLoad(const std::vector<TMonitorInfo>& Monitors) {
    InitializeKiln();
    InitializeDesktop();
    FOldMonitors = CurrentMonitors();
    FOldGetFieldAddress = GetFieldAddress;
    FOldLoaded = LoadedDesktopFormInstances;
    FOldDesktopLoaded = evDesktopLoaded;
    FStarted = true;
    auto Undo = OnFailure([this]() noexcept { Close(); });
    Screen()->SetMonitors(Monitors);
    GetFieldAddress = [this](const String& Name) -> TCustomForm** {
      auto It = FVars.find(Name);
      return It == FVars.end() ? nullptr : &It->second;
    };
    LoadedDesktopFormInstances = FLoaded.Get();
    evDesktopLoaded = FDesktopLoaded.Get();
  }
  ~TDesktopLoad() { Close(); }
  TDesktopLoad(const TDesktopLoad&) = delete;
  TDesktopLoad& operator=(const TDesktopLoad&) = delete;

  void Load(TCustomIniFile* Desktop) {
    std::vector<TDesktopSection> Sections = WindowSections(Desktop);
    if (Sections.empty())
      throw ERenderError(sDesktopNotADesktop, Desktop->FileName(), String("no section describes a window"));
    for (const TDesktopSection& S : Sections) {
      FVars.try_emplace(S.Name, nullptr);
      RegisterDesktopFormClass(S.Class, S.Name, S.Name);
    }
    // The desktop's own procedures belong to the host that registered them: a picture
    // of the windows does not run them.
    TIDEDesktopService::BeginUpdate();
    {
      auto End = Finally([]() noexcept { RunIgnoringExceptions([] { TIDEDesktopService::EndUpdate(); }); });
      LoadDesktopFormClasses(Desktop);
    }
    PumpDockingMessages();
    ProcessMessages();
    FDesktopLoaded->Send(nullptr);
    ProcessMessages();
  }

private:
  void Close() noexcept {
    if (!std::exchange(FStarted, false)) return;
    for (TClass C : {TDesktopPreviewWindow::StaticClass(), TDesktopPreviewTabHost::StaticClass(),
                     TDesktopPreviewJoinHost::StaticClass()})
      UnregisterDesktopFormClass(C);
    // A window may have gone with the host it was docked in.
    for (auto& Entry : FVars)
      if (TCustomForm* F = Entry.second; F && Exists(F)) RunIgnoringExceptions([F] { F->Destroy(); });
    RunIgnoringExceptions([] { ProcessMessages(); });
    GetFieldAddress = FOldGetFieldAddress;
    LoadedDesktopFormInstances = FOldLoaded;
    evDesktopLoaded = FOldDesktopLoaded;
    RunIgnoringExceptions([this] { Screen()->SetMonitors(FOldMonitors); });
    RunIgnoringExceptions([] { FinalizeDesktop(); });
    RunIgnoringExceptions([] { FinalizeKiln(); });
  }
  static bool Exists(const TCustomForm* F) {
    for (int I = 0; I < Screen()->FormCount(); ++I)
      if (Screen()->Forms(I) == F) return true;
    return false;
  }

  std::map<String, TCustomForm*> FVars;
  TObjectGuard<TStringList> FLoaded{new TStringList};
  TObjectGuard<TEvent> FDesktopLoaded{new TEvent};
  std::vector<TMonitorInfo> FOldMonitors;
  std::function<TCustomForm**(const String&)> FOldGetFieldAddress;
  TStringList* FOldLoaded = nullptr;
  TEvent* FOldDesktopLoaded = nullptr;
  bool FStarted = false;
};

//===----------------------------------------------------------------------===//
// The painter
//===----------------------------------------------------------------------===//

/// Room around a task bar button and its width.
constexpr int TaskbarButtonMargin = 4;
constexpr int TaskbarButtonWidth = 160;
/// The smallest task bar that holds buttons and labels.
constexpr int TaskbarMinHeight = 14;

detail::TRenderFont TextFont(std::int32_t Color, bool Bold = false) {
  detail::TRenderFont F;
  F.PixelSize = 12;
  F.Bold = Bold;
  F.Color = Color;
  return F;
}

/// Draws the monitors and the windows of the screen in their screen coordinates.
class TDesktopPainter {
public:
  TDesktopPainter(detail::TRenderCanvas& Canvas, const TRect& Desk) : FCanvas(Canvas), FDesk(Desk) {}

  void Paint() {
    FCanvas.BeginElement("Desktop", "TScreen", Bounds(-FDesk.Left, -FDesk.Top, FDesk.Width(), FDesk.Height()), false);
    FCanvas.FillRect(FDesk, DesktopBackgroundColor);
    for (int I = 0; I < Screen()->MonitorCount(); ++I) PaintMonitor(Screen()->Monitors(I));
    // Windows kept on top come last, over the others.
    std::vector<TCustomForm*> Normal, OnTop;
    for (int I = 0; I < Screen()->FormCount(); ++I) {
      TCustomForm* F = Screen()->Forms(I);
      if (F->Parent() || !F->Visible()) continue;
      auto* D = dynamic_cast<TDockableForm*>(F);
      (D && D->FormStyle() == fsStayOnTop ? OnTop : Normal).push_back(F);
    }
    for (auto* List : {&Normal, &OnTop})
      for (TCustomForm* F : *List) {
        if (F->WindowState() == wsMinimized)
          PaintTaskbarButton(F);
        else
          PaintWindow(F);
      }
    FCanvas.EndElement();
  }

private:
  void PaintMonitor(TMonitor* M) {
    TRect B = M->BoundsRect(), W = M->WorkareaRect();
    FCanvas.BeginElement("Monitor" + std::to_string(M->MonitorNum() + 1), "TMonitor", B, true);
    TRect Local = Rect(0, 0, B.Width(), B.Height());
    FCanvas.FillRect(Local, DesktopTaskbarColor);
    FCanvas.FillRect(Rect(W.Left - B.Left, W.Top - B.Top, W.Right - B.Left, W.Bottom - B.Top), DesktopWorkAreaColor);
    Frame(Local, DesktopOutlineColor);
    String Label = std::to_string(M->MonitorNum() + 1) + ": " + std::to_string(B.Width()) + "x" +
                   std::to_string(B.Height()) + (M->Primary() ? ", primary" : "") +
                   (M->PixelsPerInch() != DefaultPPI ? ", " + std::to_string(M->PixelsPerInch()) + " dpi" : "");
    TRect Bar = TaskbarOf(M);
    detail::TRenderFont Font = TextFont(DesktopOutlineColor);
    if (Bar.Height() >= TaskbarMinHeight) {
      Bar.Offset(-B.Left, -B.Top);
      double Width = FCanvas.Measure(Label, Font).Width;
      TextIn(Rect(Bar.Right - static_cast<int>(Width) - 3 * TaskbarButtonMargin, Bar.Top, Bar.Right, Bar.Bottom), Label,
             Font, false);
    } else {
      TextIn(Bounds(W.Left - B.Left + TaskbarButtonMargin, W.Top - B.Top, W.Width(), 20), Label, Font, false);
    }
    FCanvas.EndElement();
  }

  /// The part of a monitor below its work area.
  static TRect TaskbarOf(TMonitor* M) {
    TRect B = M->BoundsRect(), W = M->WorkareaRect();
    return Rect(B.Left, W.Bottom, B.Right, B.Bottom);
  }

  void PaintTaskbarButton(TCustomForm* F) {
    TMonitor* M = Screen()->MonitorFromRect(F->RestoredBounds());
    TRect Bar = TaskbarOf(M);
    if (Bar.Height() < TaskbarMinHeight) return;
    int& Used = FTaskbarButtons[M];
    TRect Button = Rect(Bar.Left + TaskbarButtonMargin + Used * (TaskbarButtonWidth + TaskbarButtonMargin),
                        Bar.Top + TaskbarButtonMargin, 0, Bar.Bottom - TaskbarButtonMargin);
    Button.Right = Button.Left + TaskbarButtonWidth;
    ++Used;
    FCanvas.BeginElement(IdOf(F), F->ClassName(), Button, true);
    TRect Local = Rect(0, 0, Button.Width(), Button.Height());
    FCanvas.FillRect(Local, DesktopCaptionColor);
    TextIn(Rect(TaskbarButtonMargin, 0, Local.Right, Local.Bottom), F->Caption(), TextFont(DesktopClientColor, true),
           false);
    FCanvas.EndElement();
  }

  /// A floating window: its frame and caption bar, its client area and what it holds.
  void PaintWindow(TCustomForm* F) {
    TRect B = F->BoundsRect();
    FCanvas.BeginElement(IdOf(F), F->ClassName(), B, true);
    TPoint O = F->ClientOffset();
    TRect Client = Bounds(O.X, O.Y, F->ClientWidth(), F->ClientHeight());
    if (!(O == TPoint{0, 0})) {
      FCanvas.FillRect(Rect(0, 0, B.Width(), B.Height()), DesktopFrameColor);
      TRect Caption = Rect(Client.Left, std::max(0, Client.Top - FormCaptionHeight), Client.Right, Client.Top);
      FCanvas.FillRect(Caption, DesktopCaptionColor);
      TextIn(Rect(Caption.Left + TaskbarButtonMargin, Caption.Top, Caption.Right, Caption.Bottom), F->Caption(),
             TextFont(DesktopClientColor, true), false);
    }
    PaintClient(F, Client, Client.TopLeft());
    FCanvas.EndElement();
  }

  /// The client area of `W` filling `Area` of its element, and its children, placed from
  /// `Origin`.
  void PaintClient(TWinControl* W, const TRect& Area, TPoint Origin) {
    FCanvas.FillRect(Area, DesktopClientColor);
    IPtr<IDockManager> Manager = DockManager(W);
    auto* Tree = dynamic_cast<TDockTree*>(Manager.Get());
    if (Tree && !DockClients(W).empty()) PaintDockTree(Tree, Area, Origin);
    for (int I = 0; I < W->ControlCount(); ++I)
      if (TControl* C = W->Controls(I); C->Visible()) PaintControl(C, Origin);
  }

  /// The splitters between the zones of a dock site and the caption strip of each client.
  void PaintDockTree(TDockTree* Tree, const TRect& Area, TPoint Origin) {
    FCanvas.FillRect(Area, DesktopSplitterColor);
    auto* Captioned = dynamic_cast<TCaptionedTabDockTree*>(Tree);
    if (!Captioned || Captioned->GetGrabberSize() <= 0 || !Tree->TopZone()) return;
    PaintZoneCaptions(Captioned, Tree->TopZone(), Origin);
  }

  void PaintZoneCaptions(TCaptionedTabDockTree* Tree, TDockZone* Zone, TPoint Origin) {
    for (int I = 0; I < Zone->ChildCount(); ++I) PaintZoneCaptions(Tree, Zone->Children(I), Origin);
    TControl* C = Zone->ChildControl();
    if (!C || !C->Visible()) return;
    TRect Caption = Tree->AdjustCaptionRect(Zone->Bounds());
    TRect Close = Tree->DockCaptionDrawer()->GetCloseRect(Caption, Tree->DockSite());
    TRect R = Caption;
    R.Offset(Origin.X, Origin.Y);
    Close.Offset(Origin.X, Origin.Y);
    FCanvas.FillRect(R, DesktopDockCaptionColor);
    Frame(Close, DesktopFrameColor);
    TextIn(Rect(R.Left + TaskbarButtonMargin, R.Top, std::max(R.Left, Close.Left), R.Bottom), C->Caption(), TextFont(0),
           false);
  }

  /// A child control by kind: tab strips, splitters, docked windows, panels.
  void PaintControl(TControl* C, TPoint Origin) {
    TRect B = C->BoundsRect();
    B.Offset(Origin.X, Origin.Y);
    FCanvas.BeginElement(IdOf(C), C->ClassName(), B, true);
    TRect Local = Rect(0, 0, B.Width(), B.Height());
    if (auto* Tabs = dynamic_cast<TTabSet*>(C)) {
      PaintTabs(Tabs, Local);
    } else if (dynamic_cast<TSplitter*>(C)) {
      FCanvas.FillRect(Local, DesktopSplitterColor);
    } else if (auto* W = dynamic_cast<TWinControl*>(C)) {
      // A docked window has no frame to show: its client area fills its place.
      PaintClient(W, Local, W->ClientOffset());
      // It shows what it is: its caption in the middle, its outline.
      if (dynamic_cast<TCustomForm*>(C)) {
        Frame(Local, DesktopSplitterColor);
        TextIn(Local, C->Caption(), TextFont(DesktopFrameColor), true);
      }
    } else {
      FCanvas.FillRect(Local, DesktopClientColor);
    }
    FCanvas.EndElement();
  }

  void PaintTabs(TTabSet* Tabs, const TRect& Local) {
    FCanvas.FillRect(Local, DesktopTabStripColor);
    for (int I = 0; I < Tabs->TabCount(); ++I) {
      TRect R = Tabs->TabRect(I);
      FCanvas.FillRect(R, I == Tabs->TabIndex() ? DesktopActiveTabColor : DesktopTabColor);
      Frame(R, DesktopSplitterColor);
      TextIn(R, Tabs->TabText(I), TextFont(0, I == Tabs->TabIndex()), true);
    }
  }

  // Pieces ------------------------------------------------------------------------
  void Frame(const TRect& R, std::int32_t Color) {
    if (R.IsEmpty()) return;
    FCanvas.FillRect(Rect(R.Left, R.Top, R.Right, R.Top + 1), Color);
    FCanvas.FillRect(Rect(R.Left, R.Bottom - 1, R.Right, R.Bottom), Color);
    FCanvas.FillRect(Rect(R.Left, R.Top, R.Left + 1, R.Bottom), Color);
    FCanvas.FillRect(Rect(R.Right - 1, R.Top, R.Right, R.Bottom), Color);
  }

  /// One line of text, vertically centred in `Box`; horizontally centred or at its left.
  void TextIn(const TRect& Box, const String& Line, const detail::TRenderFont& Font, bool Centre) {
    if (Line.empty() || Box.IsEmpty()) return;
    detail::TTextMetrics M = FCanvas.Measure(Line, Font);
    double X = Centre ? Box.Left + (Box.Width() - M.Width) / 2 : Box.Left;
    double Baseline = Box.Top + (Box.Height() - (M.Ascent + M.Descent)) / 2 + M.Ascent;
    FCanvas.Text(X, Baseline, Line, Font);
  }

  /// An element's name: the control's name, else its class and a number.
  String IdOf(TControl* C) {
    if (!C->Name().empty()) return C->Name();
    return C->ClassName() + "-" + std::to_string(++FUnnamed);
  }

  detail::TRenderCanvas& FCanvas;
  TRect FDesk;
  std::map<TMonitor*, int> FTaskbarButtons;
  int FUnnamed = 0;
};

/// Draws the screen as it stands onto a new canvas of type `TCanvas`.
template <class TCanvas> String PaintScreen() {
  TRect Desk = Screen()->DesktopRect();
  TCanvas Canvas(Desk.Width(), Desk.Height());
  TDesktopPainter(Canvas, Desk).Paint();
  return Canvas.Finish();
}

} // namespace

//===----------------------------------------------------------------------===//
// Entry points
//===----------------------------------------------------------------------===//

std::vector<TMonitorInfo> ParseMonitorSet(const String& Text) { return TMonitorSetReader(Text).Read(); }

void RenderDesktopToFile(const String& DesktopFile, const std::vector<TMonitorInfo>& Monitors, const String& FileName) {
  TRenderFormat Format = RenderFormatOf(FileName);
  CheckDesktopFile(DesktopFile);
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(DesktopFile));
  String Picture;
  {
    TDesktopLoad Load(Monitors);
    Load.Load(Desktop.Get());
    Picture = Format == rfPng ? PaintScreen<detail::TCairoCanvas>() : PaintScreen<detail::TSvgCanvas>();
  }
  try {
    WriteFileText(FileName, Picture);
  } catch (const Exception& E) {
    throw ERenderError(sRenderCannotWrite, FileName, E.Message());
  }
}

void RunDesktopCommand(const std::vector<String>& Args, std::ostream&) {
  if (Args.empty() || Args[0] != "render")
    throw EDesktopUsageError(sDesktopUnknownAction, Args.empty() ? String() : Args[0]);
  std::vector<String> Files;
  String Monitors = "1920x1080";
  for (std::size_t I = 1; I < Args.size(); ++I) {
    if (Args[I] == "--monitors") {
      if (I + 1 >= Args.size()) throw EDesktopUsageError(sDesktopMissingValue, Args[I]);
      Monitors = Args[++I];
    } else if (Args[I].rfind("--", 0) == 0 || Files.size() == 2) {
      throw EDesktopUsageError(sDesktopUnknownOption, Args[I]);
    } else {
      Files.push_back(Args[I]);
    }
  }
  if (Files.size() < 2) throw EDesktopUsageError(sDesktopMissingArguments);
  RenderDesktopToFile(Files[0], ParseMonitorSet(Monitors), Files[1]);
}

} // namespace formkit
