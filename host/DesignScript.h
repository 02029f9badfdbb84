//===- host/DesignScript.h - Scripts of design steps -----------------------===//
//
// A design script is a text file of steps, one a line, that a person would take
// in a form designer: open a module, arm the palette and drag a new component,
// press, move and release the mouse on the surface, press keys, set properties
// through their editors, bind events to handlers, rename, copy, cut, paste,
// delete, save. Each step goes through the same interfaces an IDE uses. A step
// that fails stops the script with its line number, and every file the script
// wrote is put back as it was before it ran.
//
// Example script:
//   open examples/Form1.kfm
//   create TButton 16 16
//   set Button1.Caption OK
//   bind Button1.OnClick OkClick
//   save
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"

#include <iosfwd>
#include <map>
#include <memory>
#include <optional>
#include <vector>

namespace formkit {

class TDesignSession;

/// The steps of a script, as the command's help lists them.
#define DESIGN_SCRIPT_HELP                                                                         \
  "  open FILE                 opens a module; it becomes the current one\n"                       \
  "  new FILE [ANCESTOR]       makes a new module (a descendant of ANCESTOR)\n"                    \
  "  use NAME                  makes the open module NAME the current one\n"                        \
  "  select NAME...            selects components of the current module\n"                         \
  "  press X Y [shift|ctrl|alt]...  presses the mouse at a point of the surface\n"                  \
  "  move X Y                  moves the mouse there\n"                                             \
  "  release X Y               releases the mouse there\n"                                          \
  "  drag X1 Y1 X2 Y2 [shift|ctrl|alt]...  press, move and release\n"                               \
  "  key KEY [shift|ctrl|alt]...  a key: left, right, up, down, delete, tab, enter, escape\n"       \
  "  create CLASS X Y [X2 Y2]  arms the palette with CLASS and clicks (or drags) there\n"           \
  "  set NAME.PROP VALUE       sets a property through its editor (VALUE: rest of the line)\n"     \
  "  bind NAME.EVENT HANDLER   binds an event to a handler, made in the source if new\n"          \
  "  rename NAME NEWNAME       renames a component\n"                                               \
  "  copy | cut | paste [X Y] | delete | undelete   the clipboard and deletion\n"                 \
  "  align HOW                 lines up the selection on its first item: left, right, top,\n"       \
  "                            bottom, hcenter, vcenter, hspace, vspace, hwincenter,\n"           \
  "                            vwincenter, hspaceinc, hspacedec, hspacedel, vspaceinc,\n"         \
  "                            vspacedec, vspacedel, aligntogrid, snaptogrid, sendtoback,\n"      \
  "                            bringtofront\n"                                                     \
  "  size HOW [VALUE]          sizes the selection: hgrow, hshrink, habsolute, vgrow,\n"          \
  "                            vshrink, vabsolute, widths, heights, widthheight\n"                 \
  "  flip [all]                mirrors the selected containers' children (all: the form's)\n"     \
  "  revert [yes|no]           gives the selected inherited components back their ancestor's;\n" \
  "                            the answer when that deletes their own children (else cancel)\n" \
  "  view add|remove NAME      adds a view of the module (named after a device: Phone,\n"         \
  "                            Tablet, Desktop, or any name) or removes one\n"                   \
  "  view show NAME|master     shows a view or the master; it becomes the current module\n"      \
  "  views                     prints the module's views: name, device size, file\n"            \
  "  save | saveas FILE        writes the current module and its source\n"                         \
  "  close                     closes the current module\n"                                         \
  "  expect NAME.PROP VALUE    stops the script unless the property shows VALUE\n"

FK_RESOURCESTRING(sUnknownClass, "Class %s not found");
FK_RESOURCESTRING(sNoModuleNamed, "no open module is named '%s'");

/// The component named `Name` of the open module `Root` (its own name gives its root;
/// "Frame11.Button3" a component of its nested frame Frame11).
/// Raises `EHostNotFound` "Module %s has no component named '%s'".
[[nodiscard]] FK_API TComponent* ComponentNamed(const IPtr<IRoot>& Root, const String& Name);
/// The properties the inspector lists for `Component` of `Root`, in its order.
[[nodiscard]] FK_API std::vector<IPtr<IProperty>> InspectorList(const IPtr<IRoot>& Root, TComponent* Component);
/// The inspector's editor of `Path` ("Button1.Caption") of the open module `Root`.
/// Raises `EHostNotFound` "Component %s has no property '%s'" (or the component's
/// message), `EHostError` "'%s' is not of the form NAME.PROPERTY".
[[nodiscard]] FK_API IPtr<IProperty> InspectorProperty(const IPtr<IRoot>& Root, const String& Path);
/// Sets `Path` ("Button1.Caption") of the open module `Root` to `Value` through the
/// property's editor. Raises with the editor's message when it rejects the value.
FK_API void SetPropertyText(const IPtr<IRoot>& Root, const String& Path, const String& Value);
/// What the inspector shows for `Path` of `Root`.
[[nodiscard]] FK_API String PropertyText(const IPtr<IRoot>& Root, const String& Path);

/// Keeps the bytes files had before a run first wrote them, to put them back if the
/// run fails. Files that did not exist are removed again.
class FK_API TFileJournal {
public:
  /// Remembers `Path` as it is now, once.
  void Keep(const String& Path);
  /// Puts every file back; nothing is raised.
  void Restore() noexcept;

private:
  std::map<String, std::optional<std::vector<std::uint8_t>>> FOriginals;
};

namespace detail {
class TScriptRun;
} // namespace detail

/// A design session driven step by step, as a script's lines drive it: the steps of
/// `DESIGN_SCRIPT_HELP`, each through the interfaces an IDE uses, on the current module.
/// Owns its session (one at a time in a process) and the journal of the files its saves
/// wrote; a failing step raises with the engine's message.
class FK_API TDesignSteps {
public:
  /// Steps that print (`views`) print on `Out`, which must outlive this object.
  explicit TDesignSteps(std::ostream& Out);
  ~TDesignSteps();
  TDesignSteps(const TDesignSteps&) = delete;
  TDesignSteps& operator=(const TDesignSteps&) = delete;

  /// Takes the step `Words`; `Rest` is the line after the second word, as typed.
  void Step(const std::vector<String>& Words, const String& Rest);
  /// Takes the step `Words`, its rest being the words after the second joined by blanks.
  void Step(const std::vector<String>& Words);

  TDesignSession& Session() noexcept;
  /// The module the steps work on; null before one is opened.
  [[nodiscard]] const IPtr<IRoot>& Current() const noexcept;
  /// Makes the open module `Module` the current one.
  void Use(const IPtr<IRoot>& Module);
  /// The files the saves wrote, as they were before.
  TFileJournal& Journal() noexcept;

private:
  std::unique_ptr<detail::TScriptRun> FRun;
};

/// Runs the script at `Path`, telling each step done on `Out`. Raises `EHostError`
/// "SCRIPT:LINE: message" for the first step that fails, after every file it wrote
/// was put back.
FK_API void RunDesignScript(const String& Path, std::ostream& Out);

/// Runs steps given as their words (a path may hold blanks), as a script's lines would
/// give them; what a step prints goes to `Out`. Raises the failing step's message after
/// every file the steps wrote was put back.
FK_API void RunDesignSteps(const std::vector<std::vector<String>>& Steps, std::ostream& Out);

} // namespace formkit
