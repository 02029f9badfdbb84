//===- tree/TreeStart.cpp - Globals, class icons, start and stop ---------===//
//
// The unit globals of the tree, the cache of class icons, and the steps with
// which the tree joins the start and stop of the design core.
//
//===----------------------------------------------------------------------===//
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

#include "core/DesignCore.h"

#include <unordered_map>

namespace formkit {

bool GShowClassNameInTreeView = false;
int GImageOffset = -1;
int GStateImageOffset = -1;
int GToolButtonImageOffset = -1;
const int CUIControlImageIndex[2] = {7, 8};
TCopySprigGlyphFunc CopySprigGlyphFunc;

namespace detail {
void FreeRootSprigList() noexcept;
void FreeCollectionProperties() noexcept;
} // namespace detail

namespace {
/// The icon index of each item class met so far; exists while the tree runs.
std::unique_ptr<std::unordered_map<TClass, int>> GIconCache;

void StartTree() {
  GIconCache = std::make_unique<std::unordered_map<TClass, int>>();
  detail::StartSprigRegistries();
}

void StopTree() noexcept {
  DoneDesignNotification();
  detail::FreeRootSprigList();
  detail::StopSprigRegistries();
  detail::FreeCollectionProperties();
  GIconCache.reset();
}
} // namespace

void TSprig::FigureIcon() {
  if (!GIconCache) return;
  TClass Class = FItem->ClassType();
  if (auto It = GIconCache->find(Class); It != GIconCache->end()) {
    FIconIndex = It->second;
    return;
  }
  // The class icons live in the host's palette; without its view and palette the sprig
  // keeps the image of its kind, and the next sprig of the class asks again.
  if (!IDEService<IOTAStructureView280>() || !IDEService<IOTAPaletteServices>()) return;
  (*GIconCache)[Class] = FIconIndex;
}

int SprigIconCacheSize() noexcept { return GIconCache ? static_cast<int>(GIconCache->size()) : 0; }

void InitializeStructureTree() {
  static bool Joined = false;
  if (Joined) return;
  Joined = true;
  AddDesignCoreStep(TCoreStage::Registries, "StructureTree", &StartTree, &StopTree);
  AddDesignCoreStep(TCoreStage::DefaultRegistrations, "DefaultSprigs", &detail::RegisterDefaultSprigs, nullptr);
}

} // namespace formkit
