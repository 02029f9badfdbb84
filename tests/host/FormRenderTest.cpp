//===- tests/host/FormRenderTest.cpp - Pictures of a form -----------------===//
#include "host/FormRender.h"

#include "tests/frameworks/kiln/KilnTestSupport.h"

#include <cairo.h>

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>

namespace formkit {
namespace {

using kilntest::Make;
using kilntest::TRootGuard;
namespace fs = std::filesystem;

/// A plain colour as the image holds it: 0xRRGGBB.
std::uint32_t Pixel(TColor C) {
  std::uint32_t V = static_cast<std::uint32_t>(ColorToRGB(C));
  return ((V & 0xFF) << 16) | (V & 0xFF00) | ((V >> 16) & 0xFF);
}

/// A PNG file read back with cairo.
class TPng {
public:
  explicit TPng(const fs::path& File) : FSurface(cairo_image_surface_create_from_png(File.c_str())) {}
  ~TPng() { cairo_surface_destroy(FSurface); }
  TPng(const TPng&) = delete;
  TPng& operator=(const TPng&) = delete;
  bool Valid() const { return cairo_surface_status(FSurface) == CAIRO_STATUS_SUCCESS; }
  int Width() const { return cairo_image_surface_get_width(FSurface); }
  int Height() const { return cairo_image_surface_get_height(FSurface); }
  std::uint32_t At(int X, int Y) const {
    const unsigned char* Row = cairo_image_surface_get_data(FSurface) + Y * cairo_image_surface_get_stride(FSurface);
    return *reinterpret_cast<const std::uint32_t*>(Row + 4 * X) & 0xFFFFFF;
  }
  /// How many pixels of `R` are not `Color`.
  int CountOther(const TRect& R, std::uint32_t Color) const {
    int N = 0;
    for (int Y = R.Top; Y < R.Bottom; ++Y)
      for (int X = R.Left; X < R.Right; ++X) N += At(X, Y) != Color;
    return N;
  }

private:
  cairo_surface_t* FSurface;
};

/// What a small XML reader finds in a document: whether its tags balance and its
/// entities are known, the ids in order, and for each id the id of the nearest element
/// around it that has one.
struct TXmlCheck {
  String Error;
  std::vector<String> Ids;
  std::map<String, String> ParentOf;
};

String Attribute(const String& Tag, const String& Name) {
  String Key = " " + Name + "=\"";
  std::size_t At = Tag.find(Key);
  if (At == String::npos) return "";
  At += Key.size();
  return Tag.substr(At, Tag.find('"', At) - At);
}

bool EntitiesValid(const String& Text) {
  for (std::size_t At = Text.find('&'); At != String::npos; At = Text.find('&', At + 1)) {
    bool Known = false;
    for (const char* E : {"&amp;", "&lt;", "&gt;", "&quot;", "&apos;"})
      Known |= Text.compare(At, std::strlen(E), E) == 0;
    if (!Known) return false;
  }
  return true;
}

TXmlCheck CheckXml(const String& Doc) {
  TXmlCheck R;
  std::vector<std::pair<String, String>> Open; // element name, nearest id
  std::size_t At = 0;
  while (R.Error.empty()) {
    std::size_t Lt = Doc.find('<', At);
    String Text = Doc.substr(At, Lt == String::npos ? String::npos : Lt - At);
    if (Text.find('>') != String::npos || !EntitiesValid(Text)) R.Error = "bad text: " + Text;
    if (Lt == String::npos) break;
    if (Doc.compare(Lt, 2, "<?") == 0) {
      At = Doc.find("?>", Lt) + 2;
      continue;
    }
    std::size_t Gt = Doc.find('>', Lt);
    if (Gt == String::npos) {
      R.Error = "unterminated tag";
      break;
    }
    String Tag = Doc.substr(Lt, Gt - Lt + 1);
    At = Gt + 1;
    if (Tag[1] == '/') {
      String Name = Tag.substr(2, Tag.size() - 3);
      if (Open.empty() || Open.back().first != Name) R.Error = "unbalanced " + Tag;
      else Open.pop_back();
      continue;
    }
    if (!EntitiesValid(Tag)) R.Error = "bad attribute: " + Tag;
    String Name = Tag.substr(1, Tag.find_first_of(" />", 1) - 1);
    String Id = Attribute(Tag, "id");
    String Enclosing = Open.empty() ? "" : Open.back().second;
    if (!Id.empty()) {
      R.Ids.push_back(Id);
      R.ParentOf[Id] = Enclosing;
    }
    if (Tag[Tag.size() - 2] != '/') Open.push_back({Name, Id.empty() ? Enclosing : Id});
  }
  if (R.Error.empty() && !Open.empty()) R.Error = "unclosed <" + Open.back().first + ">";
  return R;
}

String ReadFile(const fs::path& File) {
  std::ifstream In(File, std::ios::binary);
  return String(std::istreambuf_iterator<char>(In), {});
}

class FormRenderTest : public kilntest::KilnTest {
protected:
  fs::path Dir;

  void SetUp() override {
    KilnTest::SetUp();
    String Template = (fs::temp_directory_path() / "formrender-XXXXXX").string();
    ASSERT_NE(::mkdtemp(Template.data()), nullptr);
    Dir = Template;
  }
  void TearDown() override {
    fs::remove_all(Dir);
    cairo_debug_reset_static_data();
    KilnTest::TearDown();
  }
  /// The names of the files in the scratch directory.
  std::set<String> Files() const {
    std::set<String> Names;
    for (const auto& E : fs::directory_iterator(Dir)) Names.insert(E.path().filename().string());
    return Names;
  }

  /// A form of 320 by 200 with one control of each kind, a panel holding two, two
  /// overlapping panels and a timer.
  static TForm* SampleForm() {
    auto* Form = CreateComponentOf<TForm>(nullptr);
    Form->SetName("Form1");
    Form->SetClientWidth(320);
    Form->SetClientHeight(200);
    Make<TButton>(Form, Form, "Button1")->SetBounds(16, 16, 75, 25);
    auto* Panel = Make<TPanel>(Form, Form, "Panel1");
    Panel->SetBounds(120, 16, 160, 80);
    Make<TEdit>(Form, Panel, "Edit1")->SetBounds(8, 8, 121, 23);
    // Sticks out past the panel's right edge (280) towards the form's (320).
    Make<TButton>(Form, Panel, "Button2")->SetBounds(100, 48, 120, 25);
    Make<TLabel>(Form, Form, "Label1")->SetBounds(16, 60, 65, 17);
    auto* Check = Make<TCheckBox>(Form, Form, "CheckBox1");
    Check->SetBounds(16, 100, 97, 19);
    Check->SetChecked(true);
    auto* Bar = Make<TStatusBar>(Form, Form, "StatusBar1");
    Bar->Panels()->Add()->SetText("Ready");
    Bar->Panels()->Items(0)->SetWidth(100);
    Bar->Panels()->Add()->SetText("Line 1");
    auto* Red = Make<TPanel>(Form, Form, "Shape1");
    Red->SetBounds(200, 110, 60, 40);
    Red->SetColor(clRed);
    Red->SetCaption("");
    auto* Blue = Make<TPanel>(Form, Form, "Shape2");
    Blue->SetBounds(230, 120, 60, 40);
    Blue->SetColor(clBlue);
    Blue->SetCaption("");
    auto* Timer = Make<TTimer>(Form, nullptr, "Timer1");
    Timer->SetDesignInfo(150 | (150 << 16));
    return Form;
  }
  template <class T> static T* Find(TComponent* Root, const String& Name) {
    return dynamic_cast<T*>(Root->FindComponent(Name));
  }
  fs::path Render(TComponent* Root, const std::vector<TComponent*>& Selection, const String& Name = "form.png") {
    fs::path File = Dir / Name;
    RenderFormToFile(Root, Selection, File.string());
    return File;
  }
};

//===----------------------------------------------------------------------===//
// PNG
//===----------------------------------------------------------------------===//

TEST_F(FormRenderTest, PngShowsControlsByKindClippedAndStackedWithHandles) {
  TRootGuard<TForm> Form(SampleForm());
  const std::uint32_t Face = Pixel(clBtnFace);
  {
    TPng Png(Render(Form.P, {Find<TButton>(Form.P, "Button1")}));
    ASSERT_TRUE(Png.Valid());
    EXPECT_EQ(Png.Width(), 320);
    EXPECT_EQ(Png.Height(), 200);
    EXPECT_EQ(Png.At(100, 150), Face); // the background, away from the controls
    EXPECT_EQ(Png.At(5, 5), Face);
    // The button: a raised face inside a dark frame.
    EXPECT_GT(Png.CountOther(Bounds(16, 16, 75, 25), Face), 150);
    EXPECT_EQ(Png.At(30, 40), Pixel(clWindowFrame));
    EXPECT_EQ(Png.At(30, 17), Pixel(clBtnHighlight));
    EXPECT_EQ(Png.At(30, 39), Pixel(clBtnShadow));
    // Its grab handles: corners and middles of the sides, nothing between them.
    for (TPoint P : {Point(16, 16), Point(53, 16), Point(91, 16), Point(91, 28), Point(91, 41), Point(53, 41),
                     Point(16, 41), Point(16, 28), Point(14, 14), Point(18, 18)})
      EXPECT_EQ(Png.At(P.X, P.Y), Pixel(RenderHandleColor)) << P.X << "," << P.Y;
    EXPECT_EQ(Png.At(35, 14), Face);
    EXPECT_EQ(Png.At(13, 16), Face);
    // The panel's raised bevel, the white edit inside it.
    EXPECT_EQ(Png.At(120, 16), Pixel(clBtnHighlight));
    EXPECT_EQ(Png.At(279, 95), Pixel(clBtnShadow));
    EXPECT_EQ(Png.At(238, 35), Pixel(clWindow));
    // A child is cut off at its parent's edge.
    EXPECT_EQ(Png.At(250, 88), Pixel(clWindowFrame));
    EXPECT_EQ(Png.At(300, 88), Face);
    EXPECT_EQ(Png.At(300, 76), Face);
    // Z-order: the later sibling lies on top.
    EXPECT_EQ(Png.At(245, 135), Pixel(clBlue));
    EXPECT_EQ(Png.At(215, 125), Pixel(clRed));
    // The check box's tick, the status bar's line between its panels.
    EXPECT_GT(Png.CountOther(Bounds(18, 105, 9, 9), Pixel(clWindow)), 0);
    EXPECT_EQ(Png.At(100, 190), Pixel(clBtnShadow));
    // The timer's icon.
    EXPECT_EQ(Png.At(150, 150), Pixel(clWindowFrame));
    EXPECT_EQ(Png.At(151, 160), Pixel(clBtnHighlight));
  }

  Form->BringToFront(Find<TPanel>(Form.P, "Shape1"));
  Find<TCheckBox>(Form.P, "CheckBox1")->SetChecked(false);
  {
    TPng Png(Render(Form.P, {Form.P}));
    ASSERT_TRUE(Png.Valid());
    EXPECT_EQ(Png.At(245, 135), Pixel(clRed));
    EXPECT_EQ(Png.CountOther(Bounds(18, 105, 9, 9), Pixel(clWindow)), 0);
    // The form selected: handles on its client area's corners, cut at the picture's edge.
    for (TPoint P : {Point(0, 0), Point(2, 2), Point(160, 1), Point(319, 199), Point(318, 100), Point(1, 198)})
      EXPECT_EQ(Png.At(P.X, P.Y), Pixel(RenderHandleColor)) << P.X << "," << P.Y;
    EXPECT_EQ(Png.At(53, 16), Pixel(clWindowFrame)); // no handle on the button any more
  }

  // Several selected: each gets framed handles, hollow in the middle.
  {
    TPng Png(Render(Form.P, {Find<TButton>(Form.P, "Button1"), Find<TPanel>(Form.P, "Panel1")}));
    EXPECT_EQ(Png.At(118, 14), Pixel(RenderHandleColor));
    EXPECT_EQ(Png.At(122, 18), Pixel(RenderHandleColor));
    EXPECT_EQ(Png.At(120, 16), Pixel(clBtnHighlight));
    EXPECT_EQ(Png.At(14, 14), Pixel(RenderHandleColor));
    EXPECT_EQ(Png.At(15, 15), Face);
  }
  EXPECT_EQ(Files(), (std::set<String>{"form.png"}));
}

TEST_F(FormRenderTest, FramesAndDataModulesAreDrawnAtTheirOwnSize) {
  TRootGuard<TFrame> Frame(CreateComponentOf<TFrame>(nullptr));
  Frame->SetName("Frame1");
  Frame->SetBounds(10, 10, 200, 100);
  Frame->SetColor(clWhite);
  Make<TButton>(Frame.P, Frame.P, "Button1")->SetBounds(0, 0, 75, 25);
  {
    TPng Png(Render(Frame.P, {}));
    ASSERT_TRUE(Png.Valid());
    EXPECT_EQ(Png.Width(), 200);
    EXPECT_EQ(Png.Height(), 100);
    EXPECT_EQ(Png.At(150, 80), Pixel(clWhite));
    EXPECT_EQ(Png.At(0, 0), Pixel(clWindowFrame)); // the button at the frame's own origin
  }

  TRootGuard<TDataModule> Module(CreateComponentOf<TDataModule>(nullptr));
  Module->SetName("DataModule1");
  auto* Timer = Make<TTimer>(Module.P, nullptr, "Timer1");
  Timer->SetDesignInfo(20 | (30 << 16));
  // Never sized by a design window: room for the icon (28 square) and its name.
  EXPECT_EQ(RenderSize(Module.P), Point(20 + 28 + 8, 30 + 28 + 20));
  Module->SetDesignSize({150, 90});
  TPng Png(Render(Module.P, {Timer}, "module.png"));
  ASSERT_TRUE(Png.Valid());
  EXPECT_EQ(Png.Width(), 150);
  EXPECT_EQ(Png.Height(), 90);
  EXPECT_EQ(Png.At(140, 5), Pixel(clWindow));
  EXPECT_EQ(Png.At(30, 30), Pixel(clWindowFrame));
  EXPECT_EQ(Png.At(20, 30), Pixel(RenderHandleColor));
  EXPECT_EQ(Png.At(48, 58), Pixel(RenderHandleColor));
}

//===----------------------------------------------------------------------===//
// SVG
//===----------------------------------------------------------------------===//

TEST_F(FormRenderTest, SvgIsWellFormedWithOneElementPerComponentNestedAsTheControls) {
  TRootGuard<TForm> Form(SampleForm());
  Find<TLabel>(Form.P, "Label1")->SetCaption("Save & <Exit> \"now\"");
  auto* Unnamed = CreateComponentOf<TButton>(Form.P);
  Unnamed->SetParent(Form.P);
  auto* Inner = Make<TFrame>(Form.P, Form.P, "Frame1");
  Inner->SetBounds(0, 130, 100, 40);
  Make<TButton>(Inner, Inner, "Button1"); // named within the nested frame

  fs::path File = Render(Form.P, {Find<TButton>(Form.P, "Button1")}, "form.SVG");
  String Svg = ReadFile(File);
  ASSERT_EQ(Svg.rfind("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<svg xmlns=\"http://www.w3.org/2000/svg\" "
                      "width=\"320\" height=\"200\"",
                      0),
            0u);
  TXmlCheck X = CheckXml(Svg);
  ASSERT_EQ(X.Error, "");
  // The form, each component it owns, and the button of the nested frame.
  EXPECT_EQ(static_cast<int>(X.Ids.size()), 1 + Form->ComponentCount() + 1);
  EXPECT_EQ(std::set<String>(X.Ids.begin(), X.Ids.end()).size(), X.Ids.size());
  EXPECT_EQ(X.Ids.front(), "Form1");
  EXPECT_EQ(X.ParentOf["Form1"], "");
  EXPECT_EQ(X.ParentOf["Button1"], "Form1");
  EXPECT_EQ(X.ParentOf["Edit1"], "Panel1");
  EXPECT_EQ(X.ParentOf["Button2"], "Panel1");
  EXPECT_EQ(X.ParentOf["Timer1"], "Form1");
  EXPECT_EQ(X.ParentOf["Frame1.Button1"], "Frame1");
  EXPECT_EQ(X.ParentOf["TButton-1"], "Form1");
  EXPECT_NE(Svg.find("<g id=\"Button1\" class=\"TButton\" transform=\"translate(16,16)\">"), String::npos);
  EXPECT_NE(Svg.find("<g id=\"Edit1\" class=\"TEdit\" transform=\"translate(8,8)\">"), String::npos);
  EXPECT_NE(Svg.find("<g id=\"Timer1\" class=\"TTimer\" transform=\"translate(150,150)\">"), String::npos);
  EXPECT_NE(Svg.find(">Save &amp; &lt;Exit&gt; &quot;now&quot;</text>"), String::npos);
  EXPECT_NE(Svg.find(">Edit1</text>"), String::npos);
  EXPECT_NE(Svg.find(">Ready</text>"), String::npos);
  // The handles: eight squares after the last element.
  std::size_t Handles = Svg.rfind("</g>");
  int Squares = 0;
  for (std::size_t At = Svg.find("width=\"5\" height=\"5\" fill=\"#000000\"", Handles); At != String::npos;
       At = Svg.find("width=\"5\" height=\"5\" fill=\"#000000\"", At + 1))
    ++Squares;
  EXPECT_EQ(Squares, 8);
  EXPECT_EQ(Files(), (std::set<String>{"form.SVG"}));
  EXPECT_EQ(RenderFormToSvg(Form.P, {Find<TButton>(Form.P, "Button1")}), Svg);
}

//===----------------------------------------------------------------------===//
// Failures
//===----------------------------------------------------------------------===//

template <class Fn> String MessageOf(Fn&& F) {
  try {
    F();
  } catch (const ERenderError& E) {
    return E.Message();
  }
  return "(nothing raised)";
}

TEST_F(FormRenderTest, FailuresNameTheProblemAndLeaveNoFileBehind) {
  TRootGuard<TForm> Form(SampleForm());
  const String Out = (Dir / "out").string();

  EXPECT_EQ(MessageOf([&] { RenderFormToFile(Form.P, {}, Out + ".bmp"); }),
            "Cannot render to \"" + Out + ".bmp\": the file name must end in .png or .svg");
  EXPECT_EQ(MessageOf([&] { (void)RenderFormatOf("form.png.txt"); }),
            "Cannot render to \"form.png.txt\": the file name must end in .png or .svg");
  EXPECT_EQ(RenderFormatOf("a.PNG"), rfPng);

  String Missing = (Dir / "missing" / "out.png").string();
  EXPECT_EQ(MessageOf([&] { RenderFormToFile(Form.P, {}, Missing); }),
            "Cannot write \"" + Missing + "\": No such file or directory");

  fs::create_directory(Dir / "taken.svg");
  String Taken = (Dir / "taken.svg").string();
  EXPECT_EQ(MessageOf([&] { RenderFormToFile(Form.P, {}, Taken); }), "Cannot write \"" + Taken + "\": Is a directory");
  EXPECT_TRUE(fs::is_directory(Taken));

  // A failed render keeps the file that was there.
  { std::ofstream(Dir / "keep.png") << "old"; }
  TRootGuard<TForm> Other(CreateComponentOf<TForm>(nullptr));
  Other->SetName("Form2");
  auto* Stranger = Make<TButton>(Other.P, Other.P, "Button9");
  EXPECT_EQ(MessageOf([&] { RenderFormToFile(Form.P, {Stranger}, (Dir / "keep.png").string()); }),
            "Button9 is not a component of Form1");
  EXPECT_EQ(MessageOf([&] { (void)RenderFormToSvg(Form.P, {nullptr}); }), "(none) is not a component of Form1");
  EXPECT_EQ(ReadFile(Dir / "keep.png"), "old");

  EXPECT_EQ(MessageOf([&] { (void)RenderFormToPng(Stranger, {}); }),
            "Button9 is not a form, a frame or a data module");
  Other->SetClientWidth(0);
  EXPECT_EQ(MessageOf([&] { (void)RenderFormToPng(Other.P, {}); }),
            "Form2 has no area to draw (0 by " + std::to_string(Other->ClientHeight()) + ")");
  TRootGuard<TDataModule> Empty(CreateComponentOf<TDataModule>(nullptr));
  EXPECT_EQ(MessageOf([&] { (void)RenderFormToSvg(Empty.P, {}); }), "TDataModule has no area to draw (0 by 0)");
  Other->SetClientWidth(40000);
  EXPECT_EQ(MessageOf([&] { RenderFormToFile(Other.P, {}, (Dir / "keep.png").string()); }),
            String("The picture cannot be drawn: ") + cairo_status_to_string(CAIRO_STATUS_INVALID_SIZE));
  EXPECT_EQ(ReadFile(Dir / "keep.png"), "old");
  EXPECT_EQ(Files(), (std::set<String>{"keep.png", "taken.svg"}));

  // Once the render succeeds, it replaces the file.
  RenderFormToFile(Form.P, {}, (Dir / "keep.png").string());
  TPng Png(Dir / "keep.png");
  EXPECT_TRUE(Png.Valid());
  EXPECT_EQ(Files(), (std::set<String>{"keep.png", "taken.svg"}));
}

} // namespace
} // namespace formkit

// fontconfig, which cairo's text goes through, loses a block while it parses its
// configuration, once per process and inside the system's library. Only that is let
// through: whatever this program itself leaks is still reported.
extern "C" const char* __lsan_default_suppressions() { return "leak:libfontconfig.so\n"; }
