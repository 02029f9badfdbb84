//===- host/FormkitCommand.cpp - The formkit command -----------------------===//
#include "host/FormkitCommand.h"

#include "core/DesignIntfClasses.h"
#include "host/AddinCommand.h"
#include "host/DesignHost.h"
#include "host/DesignScript.h"
#include "host/DesktopRender.h"
#include "host/FormRender.h"
#include "host/StructurePrint.h"
#include "host/Studio.h"
#include "platform/TypInfo.h"

#include <filesystem>
#include <functional>
#include <map>
#include <ostream>

namespace formkit {

FK_RESOURCESTRING(sUnknownSubcommand, "Unknown subcommand '%s'. Try 'formkit --help'.");
FK_RESOURCESTRING(sUnknownOption, "Unknown option '%s' of 'formkit %s'. Try 'formkit %s --help'.");
FK_RESOURCESTRING(sMissingArguments, "'formkit %s' needs %s. Try 'formkit %s --help'.");

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
    "  align FILE HOW NAME...         lines up, spaces, centres or orders components\n"
    "  size FILE HOW NAME... [--to N] sizes components alike or to a size\n"
    "  flip FILE [--all | NAME...]    mirrors the children of containers right to left\n"
    "  revert FILE NAME... [--yes|--no]  gives inherited components their ancestor's values\n"
    "  views FILE [--add NAME]... [--remove NAME]...\n"
    "                                 lists, adds and removes the module's views\n"
    "  desktop render FILE OUT.png [--monitors MONITORS]\n"
    "                                 draws the layout a desktop file saves\n"
    "  addin FILE ACTION ARGUMENTS... lists and edits components as an add-in does\n"
    "  studio [DIR] [--port N]        serves a form designer to the browser on 127.0.0.1\n"
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

void Tree(const std::vector<String>& Args, std::ostream& Out) {
  InitializeStructureTree(); // joins the core before the session starts it
  TDesignSession Session;
  InitDesignNotification();
  PrintStructure(Session.Open(Args[0]), Out, true);
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

//===----------------------------------------------------------------------===//
// Commands that change a module through design steps
//===----------------------------------------------------------------------===//

/// Opens `File`, takes `Steps` and saves; a failing step leaves every file as it was.
void ChangeModule(const String& File, std::vector<std::vector<String>> Steps, std::ostream& Out) {
  Steps.insert(Steps.begin(), {"open", File});
  Steps.push_back({"save"});
  RunDesignSteps(Steps, Out);
}

/// The words of `Args` from `From` up to the first option, after `Verb`.
std::vector<String> WordsUpToOption(const char* Verb, const std::vector<String>& Args, std::size_t From) {
  std::vector<String> Words{Verb};
  for (std::size_t I = From; I < Args.size() && Args[I].rfind("--", 0) != 0; ++I) Words.push_back(Args[I]);
  return Words;
}

void Align(const std::vector<String>& Args, std::ostream& Out) {
  std::vector<String> Select = WordsUpToOption("select", Args, 2);
  if (Select.size() + 2 <= Args.size()) throw EUsageError(sUnknownOption, Args[Select.size() + 1], "align", "align");
  ChangeModule(Args[0], {Select, {"align", Args[1]}}, Out);
}

void Size(const std::vector<String>& Args, std::ostream& Out) {
  std::vector<String> Select = WordsUpToOption("select", Args, 2);
  std::vector<String> Step{"size", Args[1]};
  for (std::size_t I = Select.size() + 1; I < Args.size(); ++I) {
    if (Args[I] != "--to") throw EUsageError(sUnknownOption, Args[I], "size", "size");
    if (I + 1 >= Args.size()) throw EUsageError(sMissingArguments, "size --to", "a size N", "size");
    Step.push_back(Args[++I]);
  }
  if (Select.size() < 2) throw EUsageError(sMissingArguments, "size", "FILE HOW NAME...", "size");
  ChangeModule(Args[0], {Select, Step}, Out);
}

void Flip(const std::vector<String>& Args, std::ostream& Out) {
  std::vector<String> Select = WordsUpToOption("select", Args, 1);
  std::vector<std::vector<String>> Steps;
  if (Select.size() > 1) Steps.push_back(Select);
  for (std::size_t I = Select.size(); I < Args.size(); ++I)
    if (Args[I] != "--all" || Select.size() > 1) throw EUsageError(sUnknownOption, Args[I], "flip", "flip");
  Steps.push_back(Select.size() > 1 ? std::vector<String>{"flip"} : std::vector<String>{"flip", "all"});
  ChangeModule(Args[0], Steps, Out);
}

void Revert(const std::vector<String>& Args, std::ostream& Out) {
  std::vector<String> Select = WordsUpToOption("select", Args, 1);
  std::vector<String> Step{"revert"};
  for (std::size_t I = Select.size(); I < Args.size(); ++I) {
    if (Args[I] != "--yes" && Args[I] != "--no") throw EUsageError(sUnknownOption, Args[I], "revert", "revert");
    Step.resize(1);
    Step.push_back(Args[I].substr(2));
  }
  if (Select.size() < 2) throw EUsageError(sMissingArguments, "revert", "FILE NAME...", "revert");
  ChangeModule(Args[0], {Select, Step}, Out);
}

void Views(const std::vector<String>& Args, std::ostream& Out) {
  std::vector<std::vector<String>> Steps{{"open", Args[0]}};
  for (std::size_t I = 1; I < Args.size(); I += 2) {
    if (Args[I] != "--add" && Args[I] != "--remove") throw EUsageError(sUnknownOption, Args[I], "views", "views");
    if (I + 1 >= Args.size()) throw EUsageError(sMissingArguments, "views " + Args[I], "a NAME", "views");
    Steps.push_back({"view", Args[I].substr(2), Args[I + 1]});
  }
  if (Steps.size() > 1) Steps.push_back({"save"});
  Steps.push_back({"views"});
  RunDesignSteps(Steps, Out);
}

const std::map<String, TSubcommand>& Subcommands() {
  static const std::map<String, TSubcommand> Table{
      {"align",
       {"FILE HOW NAME...",
        "Lines up the components NAME... (the first one is the anchor) and saves the module.\n"
        "HOW: left, right, top, bottom, hcenter, vcenter, hspace, vspace, hwincenter,\n"
        "vwincenter, hspaceinc, hspacedec, hspacedel, vspaceinc, vspacedec, vspacedel,\n"
        "aligntogrid, snaptogrid, sendtoback, bringtofront.\n",
        3, Align}},
      {"size",
       {"FILE HOW NAME... [--to N]",
        "Sizes the components NAME... and saves the module. HOW: hgrow, hshrink, habsolute,\n"
        "vgrow, vshrink, vabsolute (to the size N), widths, heights, widthheight (alike).\n",
        3, Size}},
      {"flip",
       {"FILE [--all | NAME...]",
        "Mirrors right to left the children of the containers NAME..., or with --all every\n"
        "control of the form, and saves the module.\n",
        1, Flip}},
      {"revert",
       {"FILE NAME... [--yes|--no]",
        "Gives the inherited components NAME... back their ancestor's values and saves the\n"
        "module. Where that deletes a component's own children, --yes goes on, --no leaves\n"
        "that component out, and without either nothing is reverted.\n",
        2, Revert}},
      {"views",
       {"FILE [--add NAME]... [--remove NAME]...",
        "Adds and removes views of the module (alternate forms, saved beside it as their\n"
        "differences: Form1.Phone.kfm), saves it when it changed, and prints its views: name,\n"
        "device size (a view named after the device Phone, Tablet or Desktop takes its size)\n"
        "and file, tab-separated.\n",
        1, Views}},
      {"tree",
       {"FILE",
        "Prints the module's structure tree, one node a line, each under the one it stands in:\n"
        "components with their class names, collections by property name and their items by\n"
        "index, the components of a nested frame under the frame.\n",
        1, Tree}},
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
      {"addin",
       {"FILE list | get NAME.PROP | set NAME.PROP VALUE | create CLASS [PARENT] | delete NAME",
        ADDIN_COMMAND_HELP, 2,
        [](const std::vector<String>& Args, std::ostream& Out) {
          try {
            RunAddinCommand(Args, Out);
          } catch (const EAddinUsageError& E) {
            throw EUsageError(E.Message());
          }
        }}},
      {"studio",
       {"[DIR] [--port N]", STUDIO_COMMAND_HELP, 0,
        [](const std::vector<String>& Args, std::ostream& Out) {
          try {
            RunStudioCommand(Args, Out);
          } catch (const EStudioUsageError& E) {
            throw EUsageError(E.Message());
          }
        }}},
      {"desktop",
       {"render FILE OUT.png|OUT.svg [--monitors MONITORS]", DESKTOP_COMMAND_HELP, 3,
        [](const std::vector<String>& Args, std::ostream& Out) {
          try {
            RunDesktopCommand(Args, Out);
          } catch (const EDesktopUsageError& E) {
            throw EUsageError(E.Message());
          }
        }}},
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
