//===- host/Studio.cpp - A form designer in the browser --------------------===//
#include "host/Studio.h"

#include "core/DesignIntfClasses.h"
#include "frameworks/kiln/Kiln.h"
#include "host/DesignHost.h"
#include "host/DesignScript.h"
#include "host/FormRender.h"
#include "host/StructurePrint.h"
#include "platform/TypInfo.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <sstream>

namespace formkit {

namespace detail {

namespace {

namespace fs = std::filesystem;
using TJson = nlohmann::ordered_json;

/// A request that fails before the engine is asked: its status and message.
struct TStudioFailure {
  int Status;
  String Message;
};

template <typename... TArgs>
[[noreturn]] void Fail(int Status, const TResString& Text, const TArgs&... Args) {
  throw TStudioFailure{Status, Format(LoadResString(Text), Args...)};
}

//===----------------------------------------------------------------------===//
// The request's fields
//===----------------------------------------------------------------------===//

TJson BodyOf(const TStudioRequest& Request) {
  if (Request.Body.empty()) return TJson::object();
  TJson Body;
  try {
    Body = TJson::parse(Request.Body);
  } catch (const TJson::parse_error& E) {
    Fail(400, sStudioBadJson, String(E.what()));
  }
  if (!Body.is_object()) Fail(400, sStudioNotAnObject);
  return Body;
}

/// The field `Name` of `Body` if it is there; a field of another type than `Test` asks
/// for is refused as `Kind`.
const TJson* FieldOf(const TJson& Body, const char* Name, bool (TJson::*Test)() const noexcept, const char* Kind,
                     bool Required) {
  auto It = Body.find(Name);
  if (It == Body.end() || It->is_null()) {
    if (Required) Fail(400, sStudioField, Name, Kind);
    return nullptr;
  }
  if (!((*It).*Test)()) Fail(400, sStudioField, Name, Kind);
  return &*It;
}

String TextOf(const TJson& Body, const char* Name, bool Required = true) {
  const TJson* Field = FieldOf(Body, Name, &TJson::is_string, "a string", Required);
  return Field ? Field->get<String>() : String();
}

std::optional<int> NumberOf(const TJson& Body, const char* Name, bool Required = true) {
  const TJson* Field = FieldOf(Body, Name, &TJson::is_number_integer, "a whole number", Required);
  if (!Field) return std::nullopt;
  std::int64_t Value = Field->get<std::int64_t>();
  if (Value < -32768 || Value > 32767) Fail(400, sStudioField, Name, "a whole number from -32768 to 32767");
  return static_cast<int>(Value);
}

std::vector<String> TextsOf(const TJson& Body, const char* Name) {
  const TJson* Field = FieldOf(Body, Name, &TJson::is_array, "a list of strings", false);
  std::vector<String> Texts;
  if (!Field) return Texts;
  for (const TJson& Item : *Field) {
    if (!Item.is_string()) Fail(400, sStudioField, Name, "a list of strings");
    Texts.push_back(Item.get<String>());
  }
  return Texts;
}

//===----------------------------------------------------------------------===//
// Routes
//===----------------------------------------------------------------------===//

/// "/api/modules/Form1/mouse": the module's name and the action; both empty for other paths.
std::pair<String, String> ModuleRoute(const String& Path) {
  static const String Prefix = "/api/modules/";
  if (Path.compare(0, Prefix.size(), Prefix) != 0) return {};
  String Rest = Path.substr(Prefix.size());
  std::size_t Slash = Rest.find('/');
  if (Slash == String::npos) return {Rest, String()};
  return {Rest.substr(0, Slash), Rest.substr(Slash + 1)};
}

TJson ErrorBody(const String& Message) { return TJson{{"error", Message}}; }

TStudioReply JsonReply(const TJson& Body, int Status = 200) { return {Status, "application/json", Body.dump()}; }

} // namespace

//===----------------------------------------------------------------------===//
// TStudioSession
//===----------------------------------------------------------------------===//

/// The design session behind the studio and the routes of its API.
class TStudioSession {
public:
  explicit TStudioSession(const String& Dir) : FDirectory(DirectoryOf(Dir)) {
    InitializeStructureTree(); // the tree joins the core before the session starts it
    FSteps = std::make_unique<TDesignSteps>(FPrinted);
    InitDesignNotification();
    FSteps->Session().SearchPath.push_back(FDirectory.string());
  }

  const fs::path& Directory() const noexcept { return FDirectory; }

  TStudioReply Route(const TStudioRequest& Request) {
    const String& Method = Request.Method;
    const String& Path = Request.Path;
    if (Method == "GET" && Path == "/api/files") return JsonReply(Files());
    if (Method == "GET" && Path == "/api/modules") return JsonReply(OpenModules());
    if (Method == "GET" && Path == "/api/palette") return JsonReply(Palette());
    if (Method == "POST" && Path == "/api/open") return JsonReply(Open(BodyOf(Request)));
    if (Method == "POST" && Path == "/api/new") return JsonReply(NewModule(BodyOf(Request)));
    auto [Name, Action] = ModuleRoute(Path);
    if (!Name.empty()) {
      if (Method == "GET" && Action.empty()) return JsonReply(StateOf(Module(Name)));
      if (Method == "GET" && Action == "svg") return {200, "image/svg+xml", Picture(Module(Name))};
      if (Method == "GET" && Action == "inspector") return JsonReply(Inspector(Module(Name), Request.Query));
      if (Method == "POST") {
        if (std::optional<TJson> Reply = ModuleAction(Name, Action, BodyOf(Request))) return JsonReply(*Reply);
      }
    }
    Fail(404, sStudioNoRoute, Method, Path);
  }

private:
  static fs::path DirectoryOf(const String& Dir) {
    std::error_code Error;
    fs::path Full = fs::canonical(Dir, Error);
    if (Error || !fs::is_directory(Full)) throw EHostError(sStudioNotADirectory, Dir);
    return Full;
  }

  // Files ------------------------------------------------------------------------

  /// The form file `Name` of the directory, absolute. Refuses a name that leads outside
  /// the directory (also through a link) or that is no form file.
  fs::path FileIn(const String& Name) const {
    if (Name.empty()) Fail(400, sStudioField, "file", "a string");
    fs::path Given(Name);
    if (Given.is_absolute()) Fail(403, sStudioOutside, Name, FDirectory.string());
    fs::path Full = fs::weakly_canonical(FDirectory / Given);
    fs::path Inside = Full.lexically_relative(FDirectory);
    if (Inside.empty() || *Inside.begin() == "..") Fail(403, sStudioOutside, Name, FDirectory.string());
    if (Full.extension() != ".kfm") Fail(400, sStudioNotAFormFile, Name);
    return Full;
  }

  String RelativeName(const String& FileName) const {
    fs::path Inside = fs::path(FileName).lexically_relative(FDirectory);
    return Inside.empty() ? FileName : Inside.generic_string();
  }

  TJson Files() const {
    std::vector<String> Names;
    for (const fs::directory_entry& Entry : fs::directory_iterator(FDirectory)) {
      const fs::path& P = Entry.path();
      // A view's file ("Form1.Phone.kfm") opens with its module, not on its own.
      if (Entry.is_regular_file() && P.extension() == ".kfm" && P.stem().extension().empty())
        Names.push_back(P.filename().string());
    }
    std::sort(Names.begin(), Names.end());
    return TJson{{"files", Names}};
  }

  // Modules ----------------------------------------------------------------------

  TDesignSession& Session() { return FSteps->Session(); }

  IPtr<IRoot> Module(const String& Name) {
    FSteps->Step({"use", Name}); // raises "no open module is named '...'"
    return FSteps->Current();
  }

  TJson OpenModules() {
    TJson List = TJson::array();
    for (const IPtr<IRoot>& M : Session().Modules())
      if (M->GetRoot()) List.push_back({{"name", M->GetRootName()}, {"file", RelativeName(M->GetFileName())}});
    return TJson{{"modules", List}};
  }

  TJson Open(const TJson& Body) {
    fs::path File = FileIn(TextOf(Body, "file"));
    for (const IPtr<IRoot>& M : Session().Modules())
      if (M->GetRoot() && fs::weakly_canonical(fs::path(M->GetFileName())) == File) return StateOf(M);
    if (!fs::exists(File)) Fail(404, sStudioNoFile, TextOf(Body, "file"));
    FSteps->Step({"open", File.string()});
    return StateOf(FSteps->Current());
  }

  TJson NewModule(const TJson& Body) {
    String Given = TextOf(Body, "file");
    fs::path File = FileIn(Given);
    String Ancestor = TextOf(Body, "ancestor", false);
    if (fs::exists(File)) Fail(422, sFileExists, Given);
    std::vector<String> Step{"new", File.string()};
    if (!Ancestor.empty()) Step.push_back(Ancestor);
    FSteps->Step(Step);
    return StateOf(FSteps->Current());
  }

  static TJson Palette() {
    std::vector<String> Names;
    for (TClass Class : KilnPaletteClasses()) Names.push_back(Class->ClassName);
    std::sort(Names.begin(), Names.end());
    return TJson{{"classes", Names}};
  }

  // What the page shows of a module ------------------------------------------------

  static std::vector<TPersistent*> Selection(const IPtr<IRoot>& M) {
    IPtr<IDesignerSelections> List = CreateSelectionList();
    M->GetDesigner()->GetSelections(List);
    std::vector<TPersistent*> Items;
    for (int I = 0; I < List->GetCount(); ++I) Items.push_back(List->Get(I));
    return Items;
  }

  /// The selected components the picture can frame: the root and those it owns.
  static std::vector<TComponent*> SelectedComponents(const IPtr<IRoot>& M) {
    std::vector<TComponent*> Components;
    for (TPersistent* Item : Selection(M))
      if (auto* C = dynamic_cast<TComponent*>(Item); C && (C == M->GetRoot() || C->Owner() == M->GetRoot()))
        Components.push_back(C);
    return Components;
  }

  static String Picture(const IPtr<IRoot>& M) { return RenderFormToSvg(M->GetRoot(), SelectedComponents(M)); }

  static TJson TreeOf(TSprig* Sprig) {
    auto* Component = dynamic_cast<TComponent*>(Sprig->Item());
    TJson Children = TJson::array();
    for (int I = 0; I < Sprig->Count(); ++I) Children.push_back(TreeOf(Sprig->Items(I)));
    return TJson{{"caption", Sprig->Caption()}, {"name", Component ? Component->Name() : String()}, {"children", Children}};
  }

  static TJson TreeOf(const IPtr<IRoot>& M) {
    TRootSprig* Tree = nullptr;
    if (!RootSprigList()->FindRoot(M->GetDesigner(), Tree)) return TJson::object();
    Tree->RefreshTreeView();
    return TreeOf(Tree);
  }

  TJson StateOf(const IPtr<IRoot>& M) {
    THostModule* Record = Session().ModuleOf(M);
    TPoint Size = RenderSize(M->GetRoot());
    TJson Names = TJson::array();
    for (TPersistent* Item : Selection(M)) {
      auto* C = dynamic_cast<TComponent*>(Item);
      Names.push_back(C ? C->Name() : Item->GetNamePath());
    }
    TClass Tool = Session().Environment().ToolClass;
    return TJson{{"name", M->GetRootName()},
                 {"file", RelativeName(M->GetFileName())},
                 {"className", Record ? Record->Source().ClassName : String()},
                 {"ancestor", Record ? Record->SourceAncestor() : String()},
                 {"modified", Record && Record->IsModified()},
                 {"width", Size.X},
                 {"height", Size.Y},
                 {"selection", Names},
                 {"tool", Tool ? Tool->ClassName : String()},
                 {"svg", Picture(M)},
                 {"tree", TreeOf(M)},
                 {"source", Record ? Record->Source().Text() : String()}};
  }

  static TJson AttributeNames(TPropertyAttributes Attributes) {
    TJson Names = TJson::array();
    for (int A = 0; A <= static_cast<int>(paValueEditable); ++A)
      if (Attributes.Contains(static_cast<TPropertyAttribute>(A)))
        Names.push_back(GetEnumName(TypeInfo<TPropertyAttribute>(), A));
    return Names;
  }

  static TJson PropertyOf(const IPtr<IProperty>& P) {
    TPropertyAttributes Attributes = P->GetAttributes();
    TJson Values = TJson::array();
    if (Attributes.Contains(paValueList)) P->GetValues([&](const String& V) { Values.push_back(V); });
    PTypeInfo Type = P->GetPropType();
    return TJson{{"name", P->GetName()},
                 {"value", P->GetValue()},
                 {"kind", Type && Type->Kind == tkMethod ? "event" : "property"},
                 {"attributes", AttributeNames(Attributes)},
                 {"readOnly", Attributes.Contains(paReadOnly)},
                 {"values", Values}};
  }

  TJson Inspector(const IPtr<IRoot>& M, const std::map<String, String>& Query) {
    TComponent* Shown = M->GetRoot();
    if (auto It = Query.find("component"); It != Query.end() && !It->second.empty()) {
      Shown = ComponentNamed(M, It->second);
    } else if (std::vector<TComponent*> Selected = SelectedComponents(M); !Selected.empty()) {
      Shown = Selected.front();
    }
    TJson Properties = TJson::array();
    for (const IPtr<IProperty>& P : InspectorList(M, Shown)) Properties.push_back(PropertyOf(P));
    String Name = Shown == M->GetRoot() ? M->GetRootName() : Shown->Name();
    return TJson{{"components", {Name}}, {"properties", Properties}};
  }

  // Changes ----------------------------------------------------------------------

  /// The answer to a POST on the module `Name`; none for an unknown action.
  std::optional<TJson> ModuleAction(const String& Name, const String& Action, const TJson& Body) {
    IPtr<IRoot> M = Module(Name);
    if (Action == "close") {
      FSteps->Step({"close"});
      return OpenModules();
    }
    std::optional<std::vector<String>> Step = StepOf(M, Action, Body);
    if (!Step) return std::nullopt;
    if (!Step->empty()) FSteps->Step(*Step);
    // A step may have made another module current (a view shown): answer for the one addressed.
    return StateOf(M);
  }

  /// The design step that does `Action`; an empty step for actions done here, none for
  /// an unknown action.
  std::optional<std::vector<String>> StepOf(const IPtr<IRoot>& M, const String& Action, const TJson& Body) {
    if (Action == "property" || Action == "bind") {
      bool Bind = Action == "bind";
      String Path = TextOf(Body, "component") + "." + TextOf(Body, Bind ? "event" : "property");
      String Value = TextOf(Body, Bind ? "handler" : "value");
      IPtr<IProperty> Property = InspectorProperty(M, Path); // 404 before anything changes
      Property->SetValue(Value);
      return std::vector<String>{};
    }
    if (Action == "rename") {
      InspectorProperty(M, TextOf(Body, "component") + ".Name")->SetValue(TextOf(Body, "name"));
      return std::vector<String>{};
    }
    if (Action == "select") return SelectStep(M, TextsOf(Body, "names"));
    if (Action == "tool") {
      String Class = TextOf(Body, "class");
      TClass Armed = Class.empty() ? nullptr : GetClass(Class);
      if (!Class.empty() && !Armed) throw EHostNotFound(sUnknownClass, Class);
      Session().Environment().ToolClass = Armed;
      return std::vector<String>{};
    }
    if (Action == "create") {
      std::vector<String> Step{"create", TextOf(Body, "class"), Coordinate(Body, "x"), Coordinate(Body, "y")};
      std::optional<int> X2 = NumberOf(Body, "x2", false), Y2 = NumberOf(Body, "y2", false);
      if (X2 && Y2) Step.insert(Step.end(), {IntToStr(*X2), IntToStr(*Y2)});
      return Step;
    }
    if (Action == "mouse") return MouseStep(Body);
    if (Action == "key") {
      std::vector<String> Step{"key", TextOf(Body, "key")};
      for (const String& Shift : TextsOf(Body, "shift")) Step.push_back(Shift);
      return Step;
    }
    if (Action == "command") return CommandStep(Body);
    if (Action == "save") return std::vector<String>{"save"};
    return std::nullopt;
  }

  static String Coordinate(const TJson& Body, const char* Name) { return IntToStr(*NumberOf(Body, Name)); }

  std::vector<String> SelectStep(const IPtr<IRoot>& M, const std::vector<String>& Names) {
    std::vector<String> Step{"select"};
    if (Names.empty()) Step.push_back(M->GetRootName());
    for (const String& Name : Names) {
      (void)ComponentNamed(M, Name); // every name is checked before the selection changes
      Step.push_back(Name);
    }
    return Step;
  }

  static std::vector<String> MouseStep(const TJson& Body) {
    String Action = TextOf(Body, "action");
    static const std::map<String, String> Verbs{{"down", "press"}, {"move", "move"}, {"up", "release"}};
    auto Verb = Verbs.find(Action);
    if (Verb == Verbs.end()) Fail(400, sStudioUnknownAction, Action);
    std::vector<String> Step{Verb->second, Coordinate(Body, "x"), Coordinate(Body, "y")};
    if (Action == "down")
      for (const String& Shift : TextsOf(Body, "shift")) Step.push_back(Shift);
    return Step;
  }

  static std::vector<String> CommandStep(const TJson& Body) {
    String Command = TextOf(Body, "command");
    if (Command == "copy" || Command == "cut" || Command == "delete" || Command == "undelete")
      return {Command};
    if (Command == "paste") {
      std::optional<int> X = NumberOf(Body, "x", false), Y = NumberOf(Body, "y", false);
      if (X && Y) return {Command, IntToStr(*X), IntToStr(*Y)};
      return {Command};
    }
    if (Command == "align") return {Command, TextOf(Body, "how")};
    if (Command == "size") {
      std::optional<int> Value = NumberOf(Body, "value", false);
      std::vector<String> Step{Command, TextOf(Body, "how")};
      if (Value) Step.push_back(IntToStr(*Value));
      return Step;
    }
    if (Command == "flip") return {Command, TextOf(Body, "how", false)};
    Fail(400, sStudioUnknownCommand, Command);
  }

  fs::path FDirectory;
  std::ostringstream FPrinted;
  std::unique_ptr<TDesignSteps> FSteps;
};

struct TEmbeddedFile {
  const char* Name;
  const char* Bytes;
  std::size_t Size;
};
extern const TEmbeddedFile EmbeddedFiles[];

namespace {

String ContentTypeOf(const fs::path& Name) {
  static const std::map<String, String> Types{{".html", "text/html; charset=utf-8"},
                                              {".js", "text/javascript; charset=utf-8"},
                                              {".css", "text/css; charset=utf-8"}};
  auto It = Types.find(Name.extension().string());
  return It == Types.end() ? String("application/octet-stream") : It->second;
}

/// The page's files by the path they are served at; the page itself also at "/".
std::map<String, TStudioReply> PageFiles() {
  std::map<String, TStudioReply> Files;
  for (const TEmbeddedFile* F = EmbeddedFiles; F->Name; ++F) {
    TStudioReply Reply{200, ContentTypeOf(F->Name), String(F->Bytes, F->Size)};
    if (String(F->Name) == "index.html") Files.emplace("/", Reply);
    Files.emplace("/" + String(F->Name), std::move(Reply));
  }
  return Files;
}

} // namespace

} // namespace detail

const TStudioReply* StudioAsset(const String& Path) {
  static const std::map<String, TStudioReply> Files = detail::PageFiles();
  auto It = Files.find(Path);
  return It == Files.end() ? nullptr : &It->second;
}

//===----------------------------------------------------------------------===//
// TStudio
//===----------------------------------------------------------------------===//

TStudio::TStudio(const String& Dir) : FSession(std::make_unique<detail::TStudioSession>(Dir)) {}
TStudio::~TStudio() = default;

const std::filesystem::path& TStudio::Directory() const noexcept { return FSession->Directory(); }

TStudioReply TStudio::Handle(const TStudioRequest& Request) {
  using detail::ErrorBody;
  using detail::JsonReply;
  if (Request.Method == "GET" && Request.Path.compare(0, 5, "/api/") != 0) {
    if (const TStudioReply* Asset = StudioAsset(Request.Path)) return *Asset;
  }
  try {
    return FSession->Route(Request);
  } catch (const detail::TStudioFailure& F) {
    return JsonReply(ErrorBody(F.Message), F.Status);
  } catch (const EHostNotFound& E) {
    return JsonReply(ErrorBody(E.Message()), 404);
  } catch (const Exception& E) {
    return JsonReply(ErrorBody(E.Message()), 422);
  } catch (const std::exception& E) {
    return JsonReply(ErrorBody(E.what()), 500);
  }
}

} // namespace formkit
