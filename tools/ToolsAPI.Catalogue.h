//===- tools/ToolsAPI.Catalogue.h - Finding tool interfaces at run time --===//
//
// The catalogue of every tool interface: its name, the name of its parent,
// its unit, its identity and its type record, in declaration order, with
// look-ups by name and by identity and the count of each unit. The table is
// generated with the declarations (tools/ToolsAPI.CatalogueData.cpp).
//
// Example:
//   const TToolInterfaceInfo* Info = FindToolInterface("IOTAModule70");
//   // Info->Parent == "IOTAModule50", Info->Unit == "ToolsAPI"
//   int Count = ToolInterfaceCount("PaletteAPI");   // 22
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Interfaces.h"

#include <span>

namespace formkit {

/// One tool interface. Entries are immortal and never move.
struct TToolInterfaceInfo {
  /// The interface's name, e.g. "IOTAModule".
  const char* Name;
  /// The name of its parent; "IInterface" at the root of a family.
  const char* Parent;
  /// The unit (family) that declares it, e.g. "ToolsAPI.Editor".
  const char* Unit;
  /// The interface identity; it never changes.
  TGUID IID;
  /// The type record of the interface (kind `tkInterface`, with identity and parent).
  PTypeInfo (*TypeInfo)();
};

/// One unit of tool interfaces: its entries are `ToolInterfaces()[First .. First + Count)`.
struct TToolInterfaceUnit {
  const char* Name;
  /// The header that declares the unit's interfaces, e.g. "tools/PaletteAPI.h".
  const char* Header;
  int First;
  int Count;
};

/// Every tool interface, unit by unit, each unit in declaration order.
FK_API std::span<const TToolInterfaceInfo> ToolInterfaces() noexcept;
/// Every unit, in the order of `ToolInterfaces()`.
FK_API std::span<const TToolInterfaceUnit> ToolInterfaceUnits() noexcept;

/// The interface named `Name` without regard to ASCII case, or null. Complexity: O(log n).
FK_API const TToolInterfaceInfo* FindToolInterface(std::string_view Name);
/// The interface with identity `IID`, or null. Complexity: O(n).
FK_API const TToolInterfaceInfo* FindToolInterface(const TGUID& IID) noexcept;
/// The unit named `Unit` without regard to ASCII case, or null.
FK_API const TToolInterfaceUnit* FindToolInterfaceUnit(std::string_view Unit) noexcept;
/// The number of interfaces of unit `Unit`; 0 for an unknown unit.
FK_API int ToolInterfaceCount(std::string_view Unit) noexcept;
/// The number of all tool interfaces.
FK_API int ToolInterfaceCount() noexcept;

} // namespace formkit
