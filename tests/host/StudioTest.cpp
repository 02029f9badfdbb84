//===- tests/host/StudioTest.cpp - The studio's API and its server --------===//
#include "ExamplesFixture.h"

#include "host/DesignHost.h"
#include "host/Studio.h"

#include <httplib.h>
#include <nlohmann/json.hpp>

#include <atomic>
#include <thread>

namespace formkit::hosttest {
namespace {

using TJson = nlohmann::ordered_json;

struct StudioFixture : ExamplesFixture {
  std::unique_ptr<TStudio> Studio;

  void SetUp() override {
    ExamplesFixture::SetUp();
    Studio = std::make_unique<TStudio>(Dir.string());
  }
  void TearDown() override {
    Studio.reset();
    ExamplesFixture::TearDown();
  }
  TStudioReply Call(const String& Method, const String& Path, const String& Body = "",
                    std::map<String, String> Query = {}) {
    return Studio->Handle({Method, Path, Body, std::move(Query)});
  }
  /// The JSON of a request that must succeed.
  TJson Ok(const String& Method, const String& Path, const TJson& Body = TJson::object()) {
    TStudioReply Reply = Call(Method, Path, Method == "POST" ? Body.dump() : String());
    EXPECT_EQ(Reply.Status, 200) << Method << " " << Path << ": " << Reply.Body;
    EXPECT_EQ(Reply.ContentType, "application/json");
    return TJson::parse(Reply.Body);
  }
  /// The status and message of a request that must fail.
  std::pair<int, String> Refused(const String& Method, const String& Path, const String& Body = "") {
    TStudioReply Reply = Call(Method, Path, Body);
    TJson Error = TJson::parse(Reply.Body);
    return {Reply.Status, Error.value("error", String("(no error)"))};
  }
  static TJson Property(const TJson& Inspector, const String& Name) {
    for (const TJson& P : Inspector["properties"])
      if (P["name"] == Name) return P;
    return TJson();
  }
  static bool TreeHas(const TJson& Node, const String& Name) {
    if (Node.value("name", String()) == Name) return true;
    for (const TJson& Child : Node["children"])
      if (TreeHas(Child, Name)) return true;
    return false;
  }
  int Left(const String& Module, const String& Name) {
    TStudioReply Reply = Call("GET", "/api/modules/" + Module + "/inspector", "", {{"component", Name}});
    return std::stoi(Property(TJson::parse(Reply.Body), "Left")["value"].get<String>());
  }
};

TEST_F(StudioFixture, StudioDesignsAModuleThroughTheEngine) {
  TJson Files = Ok("GET", "/api/files");
  EXPECT_EQ(Files["files"], TJson({"Form1.kfm", "Form2.kfm", "Frame1.kfm"}));
  TJson Palette = Ok("GET", "/api/palette");
  EXPECT_NE(std::find(Palette["classes"].begin(), Palette["classes"].end(), "TButton"), Palette["classes"].end());
  EXPECT_EQ(std::find(Palette["classes"].begin(), Palette["classes"].end(), "TForm"), Palette["classes"].end());

  TJson State = Ok("POST", "/api/open", {{"file", "Form1.kfm"}});
  EXPECT_EQ(State["name"], "Form1");
  EXPECT_EQ(State["file"], "Form1.kfm");
  EXPECT_EQ(State["className"], "TForm1");
  EXPECT_EQ(State["width"], 480);
  EXPECT_EQ(State["modified"], false);
  EXPECT_NE(State["svg"].get<String>().find("id=\"Panel1\""), String::npos);
  EXPECT_EQ(State["tree"]["name"], "Form1");
  EXPECT_TRUE(TreeHas(State["tree"], "Label1"));
  // Opening it again answers the open module.
  EXPECT_EQ(Ok("POST", "/api/open", {{"file", "./Form1.kfm"}})["name"], "Form1");
  // The frame it places opened with it.
  EXPECT_EQ(Ok("GET", "/api/modules")["modules"],
            TJson::parse(R"([{"name":"Frame1","file":"Frame1.kfm"},{"name":"Form1","file":"Form1.kfm"}])"));

  // The palette's click lands on the grid, and the new button is selected.
  State = Ok("POST", "/api/modules/Form1/create", {{"class", "TButton"}, {"x", 203}, {"y", 205}});
  ASSERT_EQ(State["selection"], TJson({"Button3"}));
  EXPECT_EQ(Left("Form1", "Button3"), 200);
  EXPECT_TRUE(TreeHas(State["tree"], "Button3"));
  EXPECT_EQ(State["modified"], true);

  // The mouse drags it by (13, 10): it snaps to the 8-pixel grid.
  Ok("POST", "/api/modules/Form1/mouse", {{"action", "down"}, {"x", 210}, {"y", 210}});
  Ok("POST", "/api/modules/Form1/mouse", {{"action", "move"}, {"x", 223}, {"y", 220}});
  Ok("POST", "/api/modules/Form1/mouse", {{"action", "up"}, {"x", 223}, {"y", 220}});
  EXPECT_EQ(Left("Form1", "Button3"), 216);

  // An armed tool creates on the next press, then the palette goes back to the arrow.
  EXPECT_EQ(Ok("POST", "/api/modules/Form1/tool", {{"class", "TLabel"}})["tool"], "TLabel");
  Ok("POST", "/api/modules/Form1/mouse", {{"action", "down"}, {"x", 300}, {"y", 250}});
  State = Ok("POST", "/api/modules/Form1/mouse", {{"action", "up"}, {"x", 300}, {"y", 250}});
  EXPECT_EQ(State["tool"], "");
  EXPECT_EQ(State["selection"], TJson({"Label2"}));

  // The inspector, a caption through its editor, an event bound in the source.
  State = Ok("POST", "/api/modules/Form1/property", {{"component", "Button3"}, {"property", "Caption"}, {"value", "Go"}});
  EXPECT_NE(State["svg"].get<String>().find(">Go<"), String::npos);
  State = Ok("POST", "/api/modules/Form1/bind", {{"component", "Button3"}, {"event", "OnClick"}, {"handler", "GoClick"}});
  EXPECT_NE(State["source"].get<String>().find("GoClick"), String::npos);
  TJson Inspector = Ok("GET", "/api/modules/Form1/inspector");
  EXPECT_EQ(Inspector["components"], TJson({"Label2"}));
  TStudioReply Reply = Call("GET", "/api/modules/Form1/inspector", "", {{"component", "Button3"}});
  Inspector = TJson::parse(Reply.Body);
  EXPECT_EQ(Property(Inspector, "Caption")["value"], "Go");
  EXPECT_EQ(Property(Inspector, "OnClick")["kind"], "event");
  EXPECT_EQ(Property(Inspector, "OnClick")["value"], "GoClick");
  EXPECT_EQ(Property(Inspector, "Visible")["values"], TJson({"False", "True"}));

  // Selection, commands, rename, save.
  Ok("POST", "/api/modules/Form1/select", {{"names", {"Button1", "Button3"}}});
  Ok("POST", "/api/modules/Form1/command", {{"command", "align"}, {"how", "top"}});
  State = Ok("POST", "/api/modules/Form1/rename", {{"component", "Button3"}, {"name", "GoButton"}});
  EXPECT_TRUE(TreeHas(State["tree"], "GoButton"));
  State = Ok("POST", "/api/modules/Form1/save");
  EXPECT_EQ(State["modified"], false);
  String Saved = Read(Dir / "Form1.kfm");
  EXPECT_NE(Saved.find("object GoButton: TButton"), String::npos);
  EXPECT_NE(Saved.find("OnClick = GoClick"), String::npos);
  EXPECT_NE(Read(Dir / "Form1.fks").find("GoClick"), String::npos);
  EXPECT_EQ(Ok("POST", "/api/modules/Form1/close")["modules"], TJson::parse(R"([{"name":"Frame1","file":"Frame1.kfm"}])"));
}

TEST_F(StudioFixture, StudioCarriesAnAncestorsEditIntoItsOpenDescendant) {
  Ok("POST", "/api/open", {{"file", "Form2.kfm"}});
  TJson Open = Ok("GET", "/api/modules");
  ASSERT_EQ(Open["modules"].size(), 3u); // the ancestor and the frame opened with it
  Ok("POST", "/api/modules/Form1/property", {{"component", "Button2"}, {"property", "Caption"}, {"value", "Later"}});
  TJson Descendant = Ok("GET", "/api/modules/Form2");
  EXPECT_EQ(Descendant["ancestor"], "TForm1");
  EXPECT_NE(Descendant["svg"].get<String>().find(">Later<"), String::npos);
  // Its own edit stays its own.
  EXPECT_NE(Descendant["svg"].get<String>().find(">Save<"), String::npos);

  // A new module inheriting from the open one.
  TJson New = Ok("POST", "/api/new", {{"file", "Form3.kfm"}, {"ancestor", "Form1"}});
  EXPECT_EQ(New["name"], "Form3");
  EXPECT_EQ(New["ancestor"], "TForm1");
  EXPECT_TRUE(TreeHas(New["tree"], "Button2"));
}

TEST_F(StudioFixture, StudioRefusesBadRequestsAndChangesNothing) {
  Ok("POST", "/api/open", {{"file", "Form1.kfm"}});
  std::map<String, String> Before = Files();
  String Svg = Ok("GET", "/api/modules/Form1")["svg"];
  String Outside = Dir.string();
  std::filesystem::create_directory_symlink("/tmp", Dir / "elsewhere");

  using TCase = std::tuple<String, String, String, int, String>;
  const TCase Cases[] = {
      {"POST", "/api/open", "{\"file\": ", 400, ""},
      {"POST", "/api/open", "[1, 2]", 400, "The request must be a JSON object"},
      {"POST", "/api/open", "{}", 400, "The request needs \"file\" as a string"},
      {"POST", "/api/open", "{\"file\": 7}", 400, "The request needs \"file\" as a string"},
      {"POST", "/api/open", "{\"file\": \"../x.kfm\"}", 403, "../x.kfm lies outside " + Outside},
      {"POST", "/api/open", "{\"file\": \"/etc/x.kfm\"}", 403, "/etc/x.kfm lies outside " + Outside},
      {"POST", "/api/open", "{\"file\": \"elsewhere/x.kfm\"}", 403, "elsewhere/x.kfm lies outside " + Outside},
      {"POST", "/api/open", "{\"file\": \"Form1.fks\"}", 400, "Form1.fks is not a form file (.kfm)"},
      {"POST", "/api/open", "{\"file\": \"Form9.kfm\"}", 404, "File Form9.kfm not found"},
      {"POST", "/api/new", "{\"file\": \"Form2.kfm\"}", 422, "Form2.kfm exists already"},
      {"GET", "/api/modules/Nope", "", 404, "no open module is named 'Nope'"},
      {"POST", "/api/modules/Nope/save", "", 404, "no open module is named 'Nope'"},
      {"GET", "/api/nothing", "", 404, "Not found: GET /api/nothing"},
      {"POST", "/api/modules/Form1/fly", "{}", 404, "Not found: POST /api/modules/Form1/fly"},
      {"POST", "/api/modules/Form1/property", R"({"component": "Nope", "property": "Caption", "value": "x"})", 404,
       "Module Form1 has no component named 'Nope'"},
      {"POST", "/api/modules/Form1/property", R"({"component": "Button1", "property": "Nope", "value": "x"})", 404,
       "Component Button1 has no property 'Nope'"},
      {"POST", "/api/modules/Form1/property", R"({"component": "Button1", "property": "Left", "value": "abc"})", 422,
       "'abc' is not a valid integer value"},
      {"POST", "/api/modules/Form1/bind", R"({"component": "Button1", "event": "OnClick", "handler": "not a name"})", 422,
       "'not a name' is not a valid method name"},
      {"POST", "/api/modules/Form1/rename", R"({"component": "Button1", "name": "Button2"})", 422,
       "A component named Button2 already exists"},
      {"POST", "/api/modules/Form1/select", R"({"names": ["Button1", "Nope"]})", 404,
       "Module Form1 has no component named 'Nope'"},
      {"POST", "/api/modules/Form1/tool", R"({"class": "TNope"})", 404, "Class TNope not found"},
      {"POST", "/api/modules/Form1/mouse", R"({"action": "wave", "x": 1, "y": 1})", 400, "Unknown mouse action 'wave'"},
      {"POST", "/api/modules/Form1/mouse", R"({"action": "down", "x": 1e9, "y": 1})", 400,
       "The request needs \"x\" as a whole number"},
      {"POST", "/api/modules/Form1/mouse", R"({"action": "down", "x": 99999, "y": 1})", 400,
       "The request needs \"x\" as a whole number from -32768 to 32767"},
      {"POST", "/api/modules/Form1/command", R"({"command": "dance"})", 400, "Unknown command 'dance'"},
      {"POST", "/api/modules/Form1/command", R"({"command": "align", "how": "sideways"})", 422,
       "unknown way 'sideways'"},
  };
  for (const auto& [Method, Path, Body, Status, Message] : Cases) {
    auto [Got, Text] = Refused(Method, Path, Body);
    EXPECT_EQ(Got, Status) << Method << " " << Path << " " << Body;
    if (!Message.empty()) EXPECT_EQ(Text, Message) << Method << " " << Path << " " << Body;
    else EXPECT_EQ(Text.rfind("The request is not valid JSON: ", 0), 0u) << Text;
  }
  std::filesystem::remove(Dir / "elsewhere");
  EXPECT_EQ(Files(), Before);
  EXPECT_EQ(Ok("GET", "/api/modules/Form1")["svg"], Svg);
  EXPECT_EQ(Ok("GET", "/api/modules/Form1")["modified"], false);
  EXPECT_THROW(TStudio((Dir / "Form1.kfm").string()), EHostError);
}

TEST_F(StudioFixture, StudioServesOverLoopback) {
  std::atomic<int> Port{0};
  std::thread Server([&] { ServeStudio(*Studio, 0, [&](int Bound) { Port = Bound; }); });
  for (int Tries = 0; Tries < 500 && Port == 0; ++Tries) std::this_thread::sleep_for(std::chrono::milliseconds(10));
  ASSERT_NE(Port, 0);
  httplib::Client Local("127.0.0.1", Port);
  auto Palette = Local.Get("/api/palette");
  ASSERT_TRUE(Palette);
  EXPECT_EQ(Palette->status, 200);
  EXPECT_EQ(Palette->get_header_value("Content-Type"), "application/json");
  auto Bad = Local.Post("/api/open", "{", "application/json");
  ASSERT_TRUE(Bad);
  EXPECT_EQ(Bad->status, 400);
  auto Inspector = Local.Post("/api/open", R"({"file": "Form1.kfm"})", "application/json");
  ASSERT_TRUE(Inspector);
  auto One = Local.Get("/api/modules/Form1/inspector?component=Button1");
  ASSERT_TRUE(One);
  EXPECT_EQ(TJson::parse(One->body)["components"], TJson({"Button1"}));
  for (const char* Path : {"/../../etc/passwd", "/api/../README.md", "/studio/API.md", "/Form1.kfm"}) {
    auto Reply = Local.Get(Path);
    ASSERT_TRUE(Reply) << Path;
    EXPECT_GE(Reply->status, 400) << Path;
    EXPECT_EQ(Reply->body.find("Form1: TForm1"), String::npos) << Path;
  }
  StopStudio();
  Server.join();
}

TEST_F(ExamplesFixture, StudioCommandRefusesBadArguments) {
  EXPECT_EQ(Run({"studio", At("Form1.kfm")}), feFailed);
  EXPECT_EQ(Err.str(), "formkit studio: " + At("Form1.kfm") + " is not a directory\n");
  EXPECT_EQ(Run({"studio", Dir.string(), "--port", "http"}), feUsage);
  EXPECT_EQ(Err.str(), "'http' is not a port (0 to 65535)\n");
  EXPECT_EQ(Run({"studio", "--fast"}), feUsage);
  EXPECT_EQ(Err.str(), "Unknown option '--fast' of 'formkit studio'. Try 'formkit studio --help'.\n");
  EXPECT_EQ(Run({"studio", "--help"}), feOK);
  EXPECT_EQ(Out.str().rfind("Usage: formkit studio [DIR] [--port N]\n", 0), 0u);
}

} // namespace
} // namespace formkit::hosttest
