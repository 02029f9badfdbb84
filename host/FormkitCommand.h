//===- host/FormkitCommand.h - The formkit command -------------------------===//
//
// The `formkit` command designs modules without a window: it lists a module's
// components and the inspector's view of one of them, sets a property, converts
// a form file between text and binary, makes a new module, renders a module to
// PNG or SVG, and runs scripts of design gestures. Every subcommand works through
// the interfaces an IDE uses (the designer, the property editors, the surface's
// input) and writes through the module's `Save`.
//
// Example:
//   std::ostringstream Out, Err;
//   int Code = RunFormkit({"set", "Form1.kfm", "Button1.Caption", "OK"}, Out, Err);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <iosfwd>
#include <vector>

namespace formkit {

/// The exit codes of the command.
enum TFormkitExit : int {
  feOK = 0,     ///< done
  feFailed = 1, ///< what was asked could not be done: a file, a property, a value, a script line
  feUsage = 2   ///< an unknown subcommand or option, or arguments missing
};

/// Runs the command with `Args` (without the program's name). Output goes to `Out`,
/// messages to `Err`; returns one of `TFormkitExit`. Nothing escapes as an exception.
FK_API int RunFormkit(const std::vector<String>& Args, std::ostream& Out, std::ostream& Err);

} // namespace formkit
