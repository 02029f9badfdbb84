//===- tests/host/DesktopRenderTest.cpp - Pictures of a desktop layout ----===//
//
// A layout is built with the real windows and hosts and saved as a desktop
// file; `formkit desktop render` loads it through the desktop's machinery and
// the picture is read back with cairo and checked where a window, a caption
// bar, a tab, a dock caption and a splitter must be.
//
//===----------------------------------------------------------------------===//
#include "host/DesktopRender.h"

#include "desktop/DockHostForms.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnDockTree.h"
#include "frameworks/kiln/KilnMessages.h"
#include "host/FormkitCommand.h"
#include "platform/IniFiles.h"

#include <cairo.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>

namespace formkit {
namespace {

namespace fs = std::filesystem;

/// A tool window of the layout the tests save.
class TLayoutTool : public TDockableForm {
  FK_CLASS(TLayoutTool, TDockableForm)
};

/// A picture's colour as the image holds it: 0xRRGGBB from 0x00BBGGRR.
std::uint32_t Pixel(std::int32_t C) {
  auto V = static_cast<std::uint32_t>(C);
  return ((V & 0xFF) << 16) | (V & 0xFF00) | ((V >> 16) & 0xFF);
}

/// A PNG file read back with cairo.
class TPicture {
public:
  explicit TPicture(const fs::path& File) : FSurface(cairo_image_surface_create_from_png(File.c_str())) {}
  ~TPicture() { cairo_surface_destroy(FSurface); }
  TPicture(const TPicture&) = delete;
  TPicture& operator=(const TPicture&) = delete;
  bool Valid() const { return cairo_surface_status(FSurface) == CAIRO_STATUS_SUCCESS; }
  int Width() const { return cairo_image_surface_get_width(FSurface); }
  int Height() const { return cairo_image_surface_get_height(FSurface); }
  std::uint32_t At(TPoint P) const {
    const unsigned char* Row = cairo_image_surface_get_data(FSurface) + P.Y * cairo_image_surface_get_stride(FSurface);
    return *reinterpret_cast<const std::uint32_t*>(Row + 4 * P.X) & 0xFFFFFF;
  }

private:
  cairo_surface_t* FSurface;
};

TPoint Middle(const TRect& R) { return {R.Left + R.Width() / 2, R.Top + R.Height() / 2}; }
TRect OnScreen(TControl* C, TRect R) {
  TPoint O = C->ClientToScreen({0, 0});
  R.Offset(O.X, O.Y);
  return R;
}

/// Where the parts of the saved layout stood on the screen it was saved from.
struct TLayoutPlaces {
  TRect Messages, MessagesCaption, MessagesClient;
  TRect Hidden;
  TRect ActiveTab, OtherTab;
  TRect BreakpointsCaption, Splitter;
};

class DesktopRenderTest : public ::testing::Test {
protected:
  fs::path Dir;
  TLayoutPlaces Places;

  void SetUp() override {
    InitializeKiln();
    InitializeDesktop();
    Screen()->SetMonitors({{Rect(0, 0, 1920, 1080), Rect(0, 0, 1920, 1040), 96, true}});
    String Template = (fs::temp_directory_path() / "desktoprender-XXXXXX").string();
    ASSERT_NE(::mkdtemp(Template.data()), nullptr);
    Dir = Template;
  }
  void TearDown() override {
    fs::remove_all(Dir);
    ProcessMessages();
    FinalizeDesktop();
    FinalizeKiln();
    cairo_debug_reset_static_data();
  }

  String At(const String& Name) const { return (Dir / Name).string(); }

  int Run(const std::vector<String>& Args, String* ErrText = nullptr) {
    std::ostringstream Out, Err;
    int Code = RunFormkit(Args, Out, Err);
    if (ErrText) *ErrText = Err.str();
    return Code;
  }

  static TLayoutTool* Tool(const String& Name, const TRect& R) {
    auto* W = CreateComponentOf<TLayoutTool>(Application());
    W->SetName(Name);
    W->SetDeskSection(Name);
    W->SetCaption(Name);
    W->SetBoundsRect(R);
    W->Show();
    return W;
  }

  /// Saves a layout into "layout.dsk" and notes where its parts stood: a floating window,
  /// a hidden one, a minimised one, two windows as tabs and two joined side by side.
  String SaveLayout() {
    TLayoutTool* Messages = Tool("Messages", Rect(100, 100, 600, 400));
    TLayoutTool* Hidden = Tool("Hidden", Rect(1500, 600, 1800, 900));
    Hidden->Hide();
    TLayoutTool* Output = Tool("Output", Rect(700, 100, 900, 300));
    Output->SetWindowState(wsMinimized);
    auto* Tabs = CreateComponentOf<TTabDockHostForm>(Application());
    Tabs->SetName("DockSite0");
    Tabs->SetDeskSection("DockSite0");
    Tabs->SetBoundsRect(Rect(1000, 100, 1400, 500));
    Tabs->Show();
    TLayoutTool* Watches = Tool("Watches", Rect(0, 0, 200, 200));
    TLayoutTool* Locals = Tool("Locals", Rect(0, 0, 200, 200));
    Tabs->ManualDockClient(Watches, nullptr, alNone, false);
    Tabs->ManualDockClient(Locals, nullptr, alNone, false);
    auto* Join = CreateComponentOf<TJoinDockForm>(Application());
    Join->SetName("DockSite1");
    Join->SetDeskSection("DockSite1");
    Join->SetBoundsRect(Rect(200, 550, 900, 950));
    Join->Show();
    TLayoutTool* Breakpoints = Tool("Breakpoints", Rect(0, 0, 300, 300));
    TLayoutTool* Threads = Tool("Threads", Rect(0, 0, 300, 300));
    Join->ManualDockClient(Breakpoints, nullptr, alNone, false);
    Join->ManualDockClient(Threads, Breakpoints, alRight, false);
    ProcessMessages();

    TRect M = Messages->BoundsRect();
    Places.Messages = M;
    Places.MessagesCaption =
        Bounds(M.Left + FormFrameWidth, M.Top + FormFrameWidth, Messages->ClientWidth(), FormCaptionHeight);
    Places.MessagesClient = OnScreen(Messages, Rect(0, 0, Messages->ClientWidth(), Messages->ClientHeight()));
    Places.Hidden = Hidden->BoundsRect();
    TTabSet* Strip = Tabs->DockTab();
    EXPECT_EQ(Strip->TabIndex(), 1) << "the last docked is in front";
    Places.ActiveTab = OnScreen(Strip, Strip->TabRect(1));
    Places.OtherTab = OnScreen(Strip, Strip->TabRect(0));
    auto* Tree = dynamic_cast<TCaptionedTabDockTree*>(DockManager(Join).Get());
    EXPECT_NE(Tree, nullptr);
    TRect Left = Tree->FindControlZone(Breakpoints)->Bounds(), Right = Tree->FindControlZone(Threads)->Bounds();
    Places.BreakpointsCaption = OnScreen(Join, Tree->AdjustCaptionRect(Left));
    Places.Splitter = OnScreen(Join, Rect(Left.Right, Left.Top, Right.Left, Left.Bottom));
    EXPECT_GT(Places.Splitter.Width(), 2) << "a splitter between the two";

    String File = At("layout.dsk");
    {
      TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(File));
      for (TDesktopForm* W : std::initializer_list<TDesktopForm*>{Messages, Hidden, Output, Tabs, Watches, Locals, Join,
                                                                  Breakpoints, Threads})
        W->SaveWindowState(Desktop.Get(), false);
      Desktop->UpdateFile();
    }
    // The hosts take their clients with them.
    for (TCustomForm* F : std::initializer_list<TCustomForm*>{Tabs, Join, Messages, Hidden, Output}) F->Destroy();
    ProcessMessages();
    return File;
  }
};

FK_IMPLEMENT(TLayoutTool, "DesktopRenderTest") {}

TEST_F(DesktopRenderTest, TheSavedLayoutIsDrawnWhereTheDesktopPutsItsWindows) {
  String File = SaveLayout();
  int Forms = Screen()->FormCount();
  String Err;
  ASSERT_EQ(Run({"desktop", "render", File, At("layout.png")}, &Err), feOK) << Err;
  EXPECT_EQ(Err, "");
  TPicture Png(At("layout.png"));
  ASSERT_TRUE(Png.Valid());
  EXPECT_EQ(Png.Width(), 1920);
  EXPECT_EQ(Png.Height(), 1080);

  // On the monitors it was saved from, every part comes back where it stood.
  EXPECT_EQ(Png.At({Places.Messages.Left + 2, Places.Messages.Top + 2}), Pixel(DesktopFrameColor));
  EXPECT_EQ(Png.At({Places.MessagesCaption.Right - 20, Middle(Places.MessagesCaption).Y}), Pixel(DesktopCaptionColor));
  EXPECT_EQ(Png.At(Middle(Places.MessagesClient)), Pixel(DesktopClientColor));
  EXPECT_EQ(Png.At({Places.ActiveTab.Right - 4, Middle(Places.ActiveTab).Y}), Pixel(DesktopActiveTabColor));
  EXPECT_EQ(Png.At({Places.OtherTab.Left + 4, Middle(Places.OtherTab).Y}), Pixel(DesktopTabColor));
  EXPECT_EQ(Png.At(Middle(Places.BreakpointsCaption)), Pixel(DesktopDockCaptionColor));
  EXPECT_EQ(Png.At({Middle(Places.BreakpointsCaption).X, Places.BreakpointsCaption.Bottom + 4}),
            Pixel(DesktopClientColor))
      << "a docked window fills its place right below its caption";
  EXPECT_EQ(Png.At(Middle(Places.Splitter)), Pixel(DesktopSplitterColor));
  EXPECT_EQ(Png.At(Middle(Places.Hidden)), Pixel(DesktopWorkAreaColor)) << "a hidden window is not drawn";
  EXPECT_EQ(Png.At({150, 1060}), Pixel(DesktopCaptionColor)) << "the minimised window's button on the task bar";
  EXPECT_EQ(Png.At({400, 1042}), Pixel(DesktopTaskbarColor));
  EXPECT_EQ(Png.At({0, 500}), Pixel(DesktopOutlineColor));
  EXPECT_EQ(Screen()->FormCount(), Forms) << "the windows of the load are freed";

  // Two monitors: the primary larger, another left of it. The picture spans both, and a
  // window comes back at the same part of the primary work area.
  ASSERT_EQ(Run({"desktop", "render", File, At("wide.png"), "--monitors", "2560x1440*,1280x1024@-1280,0"}, &Err), feOK)
      << Err;
  TPicture Wide(At("wide.png"));
  ASSERT_TRUE(Wide.Valid());
  EXPECT_EQ(Wide.Width(), 3840);
  EXPECT_EQ(Wide.Height(), 1440);
  TObjectGuard<TMemIniFile> Desktop(new TMemIniFile(File));
  auto Actual = [&](const char* Key, int Range) {
    return TIDEDesktopService::RelativeToActual(Desktop->ReadInteger("Messages", Key, -1), Range);
  };
  TRect Scaled = Bounds(Actual("Left", 2560), Actual("Top", 1400), Actual("Width", 2560), Actual("Height", 1400));
  EXPECT_EQ(Scaled.Left, 133);
  TPoint Origin{1280, 0}; // the left monitor starts at -1280
  EXPECT_EQ(Wide.At({Origin.X + Scaled.Left + 2, Origin.Y + Scaled.Top + 2}), Pixel(DesktopFrameColor));
  EXPECT_EQ(Wide.At({Origin.X + Scaled.Right - 20, Origin.Y + Scaled.Top + FormFrameWidth + FormCaptionHeight / 2}),
            Pixel(DesktopCaptionColor));
  EXPECT_EQ(Wide.At({Origin.X + Scaled.Right - 20, Origin.Y + Scaled.Top - 3}), Pixel(DesktopWorkAreaColor));
  EXPECT_EQ(Wide.At({100, 1300}), Pixel(DesktopBackgroundColor)) << "below the smaller monitor";
  EXPECT_EQ(Wide.At({100, 1000}), Pixel(DesktopTaskbarColor)) << "the smaller monitor's task bar";
  EXPECT_EQ(Screen()->MonitorCount(), 1) << "the screen is given back";
  EXPECT_EQ(Screen()->PrimaryMonitor()->BoundsRect(), Rect(0, 0, 1920, 1080));
  EXPECT_EQ(GetFieldAddress, nullptr);
  EXPECT_EQ(LoadedDesktopFormInstances, nullptr);

  // The same as SVG: one element a window, nested as they are docked.
  ASSERT_EQ(Run({"desktop", "render", File, At("layout.svg")}, &Err), feOK) << Err;
  std::ifstream In(At("layout.svg"));
  String Svg((std::istreambuf_iterator<char>(In)), std::istreambuf_iterator<char>());
  for (const char* Tag :
       {"<g id=\"Monitor1\" class=\"TMonitor\"", "<g id=\"Messages\" class=\"TDesktopPreviewWindow\"",
        "<g id=\"DockSite0\" class=\"TDesktopPreviewTabHost\"", "<g id=\"DockSite1\" class=\"TDesktopPreviewJoinHost\"",
        "<g id=\"Locals\"", "<g id=\"Threads\"", "<g id=\"Output\""})
    EXPECT_NE(Svg.find(Tag), String::npos) << Tag;
  EXPECT_EQ(Svg.find("id=\"Hidden\""), String::npos);
  EXPECT_EQ(Svg.find("id=\"Watches\""), String::npos) << "a tab behind the one in front shows only its tab";
  EXPECT_LT(Svg.find("id=\"DockSite1\""), Svg.find("id=\"Threads\"")) << "a client inside its host";
}

TEST_F(DesktopRenderTest, BadFilesFailWithOneMessageAndNoPicture) {
  auto Write = [&](const String& Name, const String& Text) {
    std::ofstream(At(Name), std::ios::binary) << Text;
    return At(Name);
  };
  String Err;
  String Missing = At("missing.dsk");
  EXPECT_EQ(Run({"desktop", "render", Missing, At("out.png")}, &Err), feFailed);
  EXPECT_EQ(Err, "formkit desktop: Cannot read the desktop \"" + Missing + "\": No such file or directory\n");
  EXPECT_EQ(Run({"desktop", "render", Dir.string(), At("out.png")}, &Err), feFailed);
  EXPECT_EQ(Err, "formkit desktop: Cannot read the desktop \"" + Dir.string() + "\": Is a directory\n");
  String Binary = Write("binary.dsk", String("\x89PNG\r\n\x1a\n\0\0\0", 11));
  EXPECT_EQ(Run({"desktop", "render", Binary, At("out.png")}, &Err), feFailed);
  EXPECT_EQ(Err, "formkit desktop: \"" + Binary + "\" is no desktop file: it is not text\n");
  String Prose = Write("prose.dsk", "[Notes]\nThis is a letter, not a desktop.\n");
  EXPECT_EQ(Run({"desktop", "render", Prose, At("out.png")}, &Err), feFailed);
  EXPECT_EQ(Err, "formkit desktop: \"" + Prose + "\" is no desktop file: no section describes a window\n");
  String Fine = Write("fine.dsk", "[Messages]\nCreate=1\nVisible=1\nLeft=500\nTop=500\nWidth=2000\nHeight=2000\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, At("out.bmp")}, &Err), feFailed);
  EXPECT_EQ(Err,
            "formkit desktop: Cannot render to \"" + At("out.bmp") + "\": the file name must end in .png or .svg\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, At("no/such/dir/out.png")}, &Err), feFailed);
  EXPECT_EQ(Err.rfind("formkit desktop: Cannot write \"" + At("no/such/dir/out.png") + "\": ", 0), 0u) << Err;
  EXPECT_FALSE(fs::exists(At("out.png")));
  EXPECT_FALSE(fs::exists(At("out.bmp")));

  // Garbage values still give a picture: the window is kept on the monitor.
  String Wild = Write("wild.dsk", "[Messages]\nPercentageSizes=1\nCreate=1\nVisible=1\nLeft=-99999\nTop=abc\n"
                                  "Width=99999999\nHeight=-5\nState=7\n");
  EXPECT_EQ(Run({"desktop", "render", Wild, At("wild.png")}, &Err), feOK) << Err;
  TPicture Png(At("wild.png"));
  ASSERT_TRUE(Png.Valid());
  EXPECT_EQ(Png.Width(), 1920);
}

TEST_F(DesktopRenderTest, UsageErrorsExitWithTwo) {
  String Err;
  String Fine = At("fine.dsk");
  std::ofstream(Fine) << "[Messages]\nCreate=1\nVisible=1\n";
  EXPECT_EQ(Run({"desktop"}, &Err), feUsage);
  EXPECT_EQ(Err, "'formkit desktop' needs render FILE OUT.png|OUT.svg [--monitors MONITORS]. "
                 "Try 'formkit desktop --help'.\n");
  EXPECT_EQ(Run({"desktop", "paint", Fine, At("out.png")}, &Err), feUsage);
  EXPECT_EQ(Err, "Unknown action 'paint' of 'formkit desktop'. Try 'formkit desktop --help'.\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, At("out.png"), "--monitors"}, &Err), feUsage);
  EXPECT_EQ(Err, "'formkit desktop render --monitors' needs a value. Try 'formkit desktop --help'.\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, At("out.png"), "--scale", "2"}, &Err), feUsage);
  EXPECT_EQ(Err, "Unknown option '--scale' of 'formkit desktop render'. Try 'formkit desktop --help'.\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, At("out.png"), "extra"}, &Err), feUsage);
  EXPECT_EQ(Err, "Unknown option 'extra' of 'formkit desktop render'. Try 'formkit desktop --help'.\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, "--monitors", "1920x1080"}, &Err), feUsage) << "two files are needed";
  EXPECT_EQ(Err, "'formkit desktop render' needs FILE OUT. Try 'formkit desktop --help'.\n");
  EXPECT_EQ(Run({"desktop", "render", Fine, At("out.png"), "--monitors", "1920"}, &Err), feUsage);
  EXPECT_EQ(Err, "Cannot read the monitor set \"1920\": a size is WIDTHxHEIGHT; write each monitor as "
                 "WIDTHxHEIGHT[@LEFT,TOP][/TASKBAR][:DPI][*], separated by commas\n");
  EXPECT_FALSE(fs::exists(At("out.png")));
  std::ostringstream Out, Ignored;
  EXPECT_EQ(RunFormkit({"desktop", "--help"}, Out, Ignored), feOK);
  EXPECT_NE(Out.str().find("--monitors MONITORS"), String::npos);
  std::ostringstream Main;
  EXPECT_EQ(RunFormkit({"--help"}, Main, Ignored), feOK);
  EXPECT_NE(Main.str().find("desktop render FILE OUT.png [--monitors MONITORS]"), String::npos);
}

TEST_F(DesktopRenderTest, MonitorSetsAreReadWithTheirPlacesTaskBarsResolutionsAndPrimary) {
  std::vector<TMonitorInfo> M = ParseMonitorSet("1920x1080,1280x1024@1920,0/0:144");
  ASSERT_EQ(M.size(), 2u);
  EXPECT_EQ(M[0].BoundsRect, Rect(0, 0, 1920, 1080));
  EXPECT_EQ(M[0].WorkareaRect, Rect(0, 0, 1920, 1040));
  EXPECT_EQ(M[0].PixelsPerInch, 96);
  EXPECT_TRUE(M[0].Primary) << "the first, when none is marked";
  EXPECT_EQ(M[1].BoundsRect, Rect(1920, 0, 3200, 1024));
  EXPECT_EQ(M[1].WorkareaRect, Rect(1920, 0, 3200, 1024));
  EXPECT_EQ(M[1].PixelsPerInch, 144);
  EXPECT_FALSE(M[1].Primary);
  M = ParseMonitorSet("1024x768,800x600@-800,-100*");
  EXPECT_FALSE(M[0].Primary);
  EXPECT_TRUE(M[1].Primary);
  EXPECT_EQ(M[1].BoundsRect, Rect(-800, -100, 0, 500));

  auto Reason = [](const String& Monitors) -> String {
    try {
      (void)ParseMonitorSet(Monitors);
    } catch (const EDesktopUsageError& E) {
      String Prefix = "Cannot read the monitor set \"" + Monitors + "\": ";
      EXPECT_EQ(E.Message().rfind(Prefix, 0), 0u) << E.Message();
      return E.Message().substr(Prefix.size(), E.Message().find("; write") - Prefix.size());
    }
    return "accepted";
  };
  EXPECT_EQ(Reason(""), "a width is missing");
  EXPECT_EQ(Reason("1920x"), "a height is missing");
  EXPECT_EQ(Reason("1920x1080@5"), "a position is LEFT,TOP");
  EXPECT_EQ(Reason("1920x1080;800x600"), "unexpected ';'");
  EXPECT_EQ(Reason("0x1080"), "a monitor of 0x1080 has no area");
  EXPECT_EQ(Reason("100x40/40"), "a task bar of 40 leaves no work area");
  EXPECT_EQ(Reason("1920x1080:0"), "pixels per inch must be 1 or more");
  EXPECT_EQ(Reason("1920x1080*,800x600*"), "more than one monitor is marked primary");
  EXPECT_EQ(Reason("99999999x1080"), "a width is too large");
}

} // namespace
} // namespace formkit
