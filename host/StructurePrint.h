//===- host/StructurePrint.h - A module's structure tree as text ---------===//
//
// Prints the structure tree of a module as the host's structure view shows it:
// one sprig a line, its caption as the sprig forms it (collections by property
// name, their items with their index, class names when the tree shows them),
// each level indented two spaces under its parent. The tree must follow the
// module's designer (`InitializeStructureTree` before the core starts,
// `InitDesignNotification` after).
//
// Example:
//   InitializeStructureTree();
//   TDesignSession Session;
//   InitDesignNotification();
//   PrintStructure(Session.Open("Form2.kfm"), std::cout, true);
//   // Form2 (TForm2)
//   //   Panel1 (TPanel)
//   //     Label1 (TLabel)
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "tree/RootSprig.h"

#include <iosfwd>

namespace formkit {

/// Prints `ASprig` and every sprig below it, one caption a line in the order of the
/// tree, indented two spaces a level from `ADepth`. Does not bring the tree up to date.
FK_API void PrintSprigTree(TSprig* ASprig, std::ostream& Out, int ADepth = 0);

/// Brings the structure tree of `Root`'s module up to date and prints it; with
/// `AClassNames` each caption names its object's class, as the view does while
/// `GShowClassNameInTreeView` is set. Raises `EHostError` "No structure tree follows
/// module %s" when no tree follows the module's designer.
FK_API void PrintStructure(const IPtr<IRoot>& Root, std::ostream& Out, bool AClassNames = false);

} // namespace formkit
