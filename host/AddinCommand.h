//===- host/AddinCommand.h - A module edited the way an add-in edits it ---===//
//
// `formkit addin` lists and edits a module's components only through the tool
// interfaces an add-in gets from the host: `IOTAFormEditor` for the module,
// `IOTAComponent` for each component, property values in the buffer layout of
// their kind. A change is saved through the module's own `Save`; a failure
// leaves the file as it was.
//
// Example:
//   std::ostringstream Out;
//   RunAddinCommand({"Form1.kfm", "set", "Button1.Caption", "Done"}, Out);
//   RunAddinCommand({"Form1.kfm", "get", "Button1.Caption"}, Out);   // "Done\n"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ToolServices.h"

#include <iosfwd>
#include <vector>

namespace formkit {

/// A wrong command line of `formkit addin`: the command answers with a usage error.
FK_EXCEPTION(EAddinUsageError, Exception);
/// What an add-in asked that the module cannot do.
FK_EXCEPTION(EAddinError, Exception);

FK_RESOURCESTRING(sAddinNoComponent, "The module has no component named '%s'");
FK_RESOURCESTRING(sAddinNoProperty, "%s has no property '%s'");
FK_RESOURCESTRING(sAddinNotSettable, "Property %s.%s cannot be set by an add-in");
FK_RESOURCESTRING(sAddinBadValue, "'%s' is not a valid value for %s.%s");
FK_RESOURCESTRING(sAddinCannotCreate, "Cannot create a component of class '%s'");
FK_RESOURCESTRING(sAddinCannotDelete, "%s cannot be deleted: the module's form does not own it");
FK_RESOURCESTRING(sAddinBadAction, "Unknown action '%s' of 'formkit addin'. Try 'formkit addin --help'.");
FK_RESOURCESTRING(sAddinArguments, "'formkit addin %s' needs %s. Try 'formkit addin --help'.");
FK_RESOURCESTRING(sAddinExtraArgument, "Unexpected argument '%s' of 'formkit addin %s'. Try 'formkit addin --help'.");

/// The text of the value of property `Prop` of `Component`, read by its kind: numbers,
/// enumeration names, characters and strings as they are, "(none)" for an empty event
/// or object, the class name in parentheses for an object. Raises `EAddinError`
/// `sAddinNoProperty` for an unknown property.
[[nodiscard]] FK_API String AddinPropertyText(const IPtr<IOTAComponent>& Component, const String& Prop);

/// Sets property `Prop` of `Component` from `Text`, in the buffer layout of its kind.
/// Raises `EAddinError` `sAddinNoProperty`, `sAddinNotSettable` (objects, events and
/// 64-bit ordinals) or `sAddinBadValue`; nothing has changed then.
FK_API void SetAddinProperty(const IPtr<IOTAComponent>& Component, const String& Prop, const String& Text);

/// Runs `formkit addin FILE ACTION ARGUMENTS...` (`Args` starts at FILE): `list`,
/// `get NAME.PROP`, `set NAME.PROP VALUE`, `create CLASS [PARENT]`, `delete NAME`.
/// Raises `EAddinUsageError` for a wrong command line, `EAddinError` for a request the
/// module refuses, and what opening and saving raise.
FK_API void RunAddinCommand(const std::vector<String>& Args, std::ostream& Out);

/// The help text of `formkit addin`.
#define ADDIN_COMMAND_HELP                                                                                             \
  "Lists and edits the module's components the way an add-in of an IDE does, through the\n"                          \
  "module's form editor and one component interface for each component. ACTION is one of:\n"                         \
  "  list                   every component: name, class and visual parent, tab-separated\n"                         \
  "  get NAME.PROP          the value of a property\n"                                                               \
  "  set NAME.PROP VALUE    sets a property and saves the module\n"                                                  \
  "  create CLASS [PARENT]  makes a component in PARENT (or on the form), prints its name\n"                         \
  "                         and saves the module\n"                                                                  \
  "  delete NAME            deletes a component and saves the module\n"                                             \
  "NAME may be the module's own name. Enumerations are read and written by name, sets as\n"                          \
  "their bit mask, characters as one character; objects and events are read only.\n"

} // namespace formkit
