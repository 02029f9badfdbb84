//===- tools/ToolsAPI.Catalogue.cpp - Finding tool interfaces ------------===//
//
// Look-ups over the generated table: by name through an index sorted without
// regard to case, built at first use; by identity and by unit by a walk.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.Catalogue.h"

#include <algorithm>
#include <vector>

namespace formkit {

namespace {

/// The entries sorted by name without regard to case. Built on first use.
const std::vector<const TToolInterfaceInfo*>& ByName() {
  static const std::vector<const TToolInterfaceInfo*> Index = [] {
    std::vector<const TToolInterfaceInfo*> V;
    for (const TToolInterfaceInfo& Info : ToolInterfaces()) V.push_back(&Info);
    std::sort(V.begin(), V.end(), [](const TToolInterfaceInfo* A, const TToolInterfaceInfo* B) {
      return CompareText(A->Name, B->Name) < 0;
    });
    return V;
  }();
  return Index;
}

} // namespace

const TToolInterfaceInfo* FindToolInterface(std::string_view Name) {
  const auto& Index = ByName();
  auto It = std::lower_bound(Index.begin(), Index.end(), Name,
                             [](const TToolInterfaceInfo* Info, std::string_view Key) {
                               return CompareText(Info->Name, Key) < 0;
                             });
  if (It != Index.end() && SameText((*It)->Name, Name)) return *It;
  return nullptr;
}

const TToolInterfaceInfo* FindToolInterface(const TGUID& IID) noexcept {
  for (const TToolInterfaceInfo& Info : ToolInterfaces())
    if (Info.IID == IID) return &Info;
  return nullptr;
}

const TToolInterfaceUnit* FindToolInterfaceUnit(std::string_view Unit) noexcept {
  for (const TToolInterfaceUnit& U : ToolInterfaceUnits())
    if (SameText(U.Name, Unit)) return &U;
  return nullptr;
}

int ToolInterfaceCount(std::string_view Unit) noexcept {
  const TToolInterfaceUnit* U = FindToolInterfaceUnit(Unit);
  return U ? U->Count : 0;
}

int ToolInterfaceCount() noexcept { return static_cast<int>(ToolInterfaces().size()); }

} // namespace formkit
