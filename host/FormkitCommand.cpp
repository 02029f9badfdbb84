//===- host/FormkitCommand.cpp - The formkit command -----------------------===//
#include "host/FormkitCommand.h"

#include "core/DesignIntfClasses.h"
#include "host/DesignHost.h"
#include "host/DesignScript.h"
#include "host/FormRender.h"
#include "platform/TypInfo.h"

#include <filesystem>
#include <functional>
#include <map>
#include <ostream>

namespace formkit {

FK_RESOURCESTRING(sUnknownSubcommand, "Unknown subcommand '%s'. Try 'formkit --help'.");
FK_RESOURCESTRING(sUnknownOption, "Unknown option '%s' of 'formkit %s'. Try 'formkit %s --help'.");
FK_RESOURCESTRING(sMissingArguments, "'formkit %s' needs %s. Try 'formkit %s --help'.");
FK_RESOURCESTRING(sFileExists, "%s exists already");

namespace {

const char* const MainHelp =
    "Usage: formkit SUBCOMMAND ARGUMENTS...\n"
    "\n"
    "Designs form modules (.kfm files) without a window, through the same designer an IDE uses.\n"
    "\n"
    "Subcommands:\n"
    "  tree FILE                      the module's components, nested as they stand\n"
    "  props FILE NAME                the inspector's list for one component\n"
    "  set FILE NAME.PROP VALUE       sets a property through its editor and saves\n"
    "  convert FILE --text|--binary   writes the form file as text or binary\n"
    "  new FILE [--inherit ANCESTOR]  makes a new module, a descendant when asked\n"
    "  run SCRIPT                     runs a script of design steps, one a line\n"
    "  render FILE OUT.png|OUT.svg [--select NAME...]\n"
    "                                 draws the module, the named components selected\n"
    "\n"
    "'formkit SUBCOMMAND --help' tells more of each.\n"
    "\n"
    "Exit codes: 0 done; 1 what was asked could not be done (a missing or unreadable file,\n"
    "a corrupt module, a property that does not exist, a value the editor rejects, a failing\n"
    "script line), and no file was changed; 2 an unknown subcommand or option, or missing\n"
    "arguments.\n";

struct TSubcommand {
  const char* Arguments;
  const char* Help;
  int MinArgs;
  std::function<void(const std::vector<String>&, std::ostream&)> Run;
};

/// Raised for a usage error of a subcommand.
FK_EXCEPTION(EUsageError, Exception);

String AttributeText(TPropertyAttributes Attributes) {
  String Text;
  for (int A = 0; A <= static_cast<int>(paValueEditable); ++A)
    if (Attributes.Contains(static_cast<TPropertyAttribute>(A)))
      Text += (Text.empty() ? "" : ",") + GetEnumName(TypeInfo<TPropertyAttribute>(), A);
  return Text;
}

void PrintTree(TComponent* Component, TComponent* Root, int Depth, std::ostream& Out) {
  Out << String(static_cast<std::size_t>(Depth) * 2, ' ') << Component->Name() << ": " << Component->ClassName() << "\n";
  // A nested frame's insides are the frame's own components.
  TComponent* Lookup = Component->ComponentState().Contains(csInline) ? Component : Root;
  std::vector<TComponent*> Children;
  Component->GetChildren([&](TComponent* Child) { Children.push_back(Child); }, Lookup);
  for (TComponent* Child : Children) PrintTree(Child, Lookup, Depth + 1, Out);
}

void Tree(const std::vector<String>& Args, std::ostream& Out) {
  TDesignSession Session;
  IPtr<IRoot> Root = Session.Open(Args[0]);
  PrintTree(Root->GetRoot(), Root->GetRoot(), 0, Out);
}

void Props(const std::vector<String>& Args, std::ostream& Out) {
  TDesignSession Session;
  IPtr<IRoot> Root = Session.Open(Args[0]);
  for (const IPtr<IProperty>& P : InspectorList(Root, ComponentNamed(Root, Args[1]))) {
    Out << P->GetName() << "\t" << P->GetValue() << "\t" << AttributeText(P->GetAttributes()) << "\n";
  }
}

void Set(const std::vector<String>& Args, std::ostream&) {
  TDesignSession Session;
  IPtr<IRoot> Root = Session.Open(Args[0]);
  SetPropertyText(Root, Args[1], Args[2]);
  Session.Save(Root);
}

void Convert(const std::vector<String>& Args, std::ostream&) {
  if (Args[1] != "--text" && Args[1] != "--binary") throw EUsageError(sUnknownOption, Args[1], "convert", "convert");
  TDesignSession Session;
  IPtr<IRoot> Root = Session.Open(Args[0]);
  TDesignSession::RootOf(Root)->SetTextLYT(Args[1] == "--text");
  Session.Save(Root);
}

void NewModule(const std::vector<String>& Args, std::ostream&) {
  String Ancestor;
  for (std::size_t I = 1; I < Args.size(); ++I) {
    if (Args[I] != "--inherit") throw EUsageError(sUnknownOption, Args[I], "new", "new");
    if (I + 1 >= Args.size()) throw EUsageError(sMissingArguments, "new --inherit", "an ANCESTOR", "new");
    Ancestor = Args[++I];
  }
  if (std::filesystem::exists(Args[0])) throw EHostError(sFileExists, Args[0]);
  TDesignSession Session;
  IPtr<IRoot> Root = Session.NewModule(Args[0], Ancestor);
  Session.Save(Root);
}

void Run(const std::vector<String>& Args, std::ostream& Out) {
  if (Args.size() > 1) throw EUsageError(sUnknownOption, Args[1], "run", "run");
  RunDesignScript(Args[0], Out);
}

void Render(const std::vector<String>& Args, std::ostream&) {
  std::vector<String> Selected;
  for (std::size_t I = 2; I < Args.size(); ++I) {
    if (Args[I] != "--select") throw EUsageError(sUnknownOption, Args[I], "render", "render");
    for (++I; I < Args.size() && Args[I].rfind("--", 0) != 0; ++I) Selected.push_back(Args[I]);
    --I;
  }
  TDesignSession Session;
  IPtr<IRoot> Root = Session.Open(Args[0]);
  std::vector<TComponent*> Selection;
  for (const String& Name : Selected) Selection.push_back(ComponentNamed(Root, Name));
  RenderFormToFile(Root->GetRoot(), Selection, Args[1]);
}

const std::map<String, TSubcommand>& Subcommands() {
  static const std::map<String, TSubcommand> Table{
      {"tree", {"FILE", "Prints the module's components, one a line, each under the one it stands in.\n", 1, Tree}},
      {"props",
       {"FILE NAME",
        "Prints what the inspector lists for component NAME (or the module's own name): one\n"
        "property a line, its name, its value text and its editor's attributes, tab-separated.\n",
        2, Props}},
      {"set",
       {"FILE NAME.PROP VALUE",
        "Sets property PROP of component NAME to VALUE through the property's editor, as the\n"
        "inspector does, and saves the module. A value the editor rejects changes nothing.\n",
        3, Set}},
      {"convert", {"FILE --text|--binary", "Writes the form file in text or in binary form.\n", 2, Convert}},
      {"new",
       {"FILE [--inherit ANCESTOR]",
        "Makes a new module named after FILE, a form of its own or a descendant of the module\n"
        "ANCESTOR (found beside FILE), with its source file, and saves it.\n",
        1, NewModule}},
      {"run",
       {"SCRIPT",
        "Runs SCRIPT, one step a line ('#' starts a comment):\n" DESIGN_SCRIPT_HELP
        "A failing line prints its line number and the message, and every file is left as it\n"
        "was before the script ran.\n",
        1, Run}},
      {"render",
       {"FILE OUT.png|OUT.svg [--select NAME...]",
        "Draws the module at its own size into a PNG or an SVG file, the named components\n"
        "selected with their grab handles.\n",
        2, Render}},
  };
  return Table;
}

bool WantsHelp(const std::vector<String>& Args) {
  for (const String& A : Args)
    if (A == "--help" || A == "-h") return true;
  return false;
}

} // namespace

int RunFormkit(const std::vector<String>& Args, std::ostream& Out, std::ostream& Err) {
  if (Args.empty() || Args[0] == "--help" || Args[0] == "-h" || Args[0] == "help") {
    (Args.empty() ? Err : Out) << MainHelp;
    return Args.empty() ? feUsage : feOK;
  }
  auto It = Subcommands().find(Args[0]);
  if (It == Subcommands().end()) {
    Err << Format(LoadResString(sUnknownSubcommand), Args[0]) << "\n";
    return feUsage;
  }
  const TSubcommand& Sub = It->second;
  std::vector<String> Rest(Args.begin() + 1, Args.end());
  if (WantsHelp(Rest)) {
    Out << "Usage: formkit " << It->first << " " << Sub.Arguments << "\n\n" << Sub.Help;
    return feOK;
  }
  try {
    if (static_cast<int>(Rest.size()) < Sub.MinArgs)
      throw EUsageError(sMissingArguments, It->first, Sub.Arguments, It->first);
    Sub.Run(Rest, Out);
    return feOK;
  } catch (const EUsageError& E) {
    Err << E.Message() << "\n";
    return feUsage;
  } catch (const Exception& E) {
    Err << "formkit " << It->first << ": " << E.Message() << "\n";
    return feFailed;
  } catch (const std::exception& E) {
    Err << "formkit " << It->first << ": " << E.what() << "\n";
    return feFailed;
  }
}

} // namespace formkit
