//===- platform/Rtti.h - Finding a type by its qualified name -------------===//
//
// The run-time type context: every type record the program has built, found by
// name. A class is known by its qualified name ("Unit.Class", as
// `QualifiedClassName` gives it) once its record exists; any other type
// (enumerations, sets, methods, interfaces, simple types) by its own name.
// Records come into being on first use, so a type the program never touched is
// not known: the same as a type the linker left out.
//
// Example:
//   TRttiContext Context;
//   PTypeInfo Type = Context.FindType("Classes.TPersistent"); // kind tkClass
//   if (!Type) ...                                            // no such type
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/TypInfo.h"

namespace formkit {

/// The types the program knows, by name. Cheap to make: it holds nothing of its own.
class FK_API TRttiContext {
public:
  /// The type of that name, compared without regard to case; null when there is none.
  /// Complexity: one hash lookup.
  [[nodiscard]] PTypeInfo FindType(std::string_view QualifiedName) const;
};

namespace detail {
/// Makes `Info` known to every `TRttiContext`; records are immortal, so is the entry.
/// The builders of type and class records call it.
FK_API void RememberType(PTypeInfo Info, const String& QualifiedName);
} // namespace detail

} // namespace formkit
