//===- host/StructurePrint.cpp - A module's structure tree as text -------===//
#include "host/StructurePrint.h"

#include "host/DesignHost.h"
#include "platform/ScopeGuard.h"

#include <ostream>

namespace formkit {

namespace {
FK_RESOURCESTRING(sNoStructureTree, "No structure tree follows module %s");
} // namespace

void PrintSprigTree(TSprig* ASprig, std::ostream& Out, int ADepth) {
  Out << String(static_cast<std::size_t>(ADepth) * 2, ' ') << ASprig->Caption() << "\n";
  for (int I = 0; I < ASprig->Count(); ++I) PrintSprigTree(ASprig->Items(I), Out, ADepth + 1);
}

void PrintStructure(const IPtr<IRoot>& Root, std::ostream& Out, bool AClassNames) {
  const bool Shown = std::exchange(GShowClassNameInTreeView, AClassNames);
  auto Restore = Finally([Shown]() noexcept { GShowClassNameInTreeView = Shown; });
  TRootSprig* Tree = nullptr;
  if (!RootSprigList()->FindRoot(Root->GetDesigner(), Tree)) throw EHostError(sNoStructureTree, Root->GetRootName());
  Tree->RefreshTreeView();
  PrintSprigTree(Tree, Out);
}

} // namespace formkit
