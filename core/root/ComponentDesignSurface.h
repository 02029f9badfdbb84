//===- core/root/ComponentDesignSurface.h - What a root asks of its surface ===//
//
// The surface of a module on design, as its root drives it: refresh, options,
// removal of items, and the initialising flag while the designer opens. A
// framework's concrete surface implements it; `TComponentRoot` holds one.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "surface/Designer.h"

namespace formkit {

/// The options a root hands its surface.
struct FK_API TDesignSurfaceOptions {
  bool DisplayGrid = true;
  bool ScaleGridSize = false;
  TPoint GridSize{8, 8};
  bool ShowComponentCaptions = false;
  bool ShowDesignerHints = true;
  bool ShowNonVisualComponents = true;
  bool ShowExtendedControlHints = false;
};

/// The surface as the root sees it: the engine's `IDesignSurface` and what a root adds.
struct FK_API IComponentDesignSurface : IDesignSurface {
  FK_INTERFACE(IComponentDesignSurface, IDesignSurface, "{5A4C18CF-7A59-5A45-B0C8-3E7FA7C1C16A}")
  /// Brings the surface up to date with the components.
  virtual void UpdateSurface() = 0;
  /// Drops cached items.
  virtual void RefreshItems() = 0;
  /// The module is about to report a change.
  virtual void BeforeRootModified() = 0;
  /// The component leaves the module.
  virtual void ItemRemoved(TComponent* Component) = 0;
  virtual void SetOptions(const TDesignSurfaceOptions& Options) = 0;
  /// True while the designer opens: no notifications from the surface.
  virtual void SetInitializing(bool Value) = 0;
};

/// What the root needs of the items it made itself.
struct FK_API IInternalItem : IItem {
  FK_INTERFACE(IInternalItem, IItem, "{7ED7BF32-E349-11D3-AB4A-00C04FB17A72}")
  virtual IPtr<IItem> GetChildren(int Index) = 0;
  virtual int GetChildCount() = 0;
  virtual IPtr<IComponentEditor> GetEditor() = 0;
  virtual bool GetMarked() = 0;
  virtual void SetMarked(bool Value) = 0;
  virtual void SetParent(const IPtr<IItem>& Parent) = 0;
  virtual void Show() = 0;
  virtual void ZOrder(bool Front) = 0;
  virtual void FlipChildren() = 0;
};

/// The pixels per inch of a parent item; 96 when no framework sets it.
FK_API extern std::function<int(const IPtr<IItem>& Item)> GetPPIForKilnDesignerForIItemFunc;
/// The hook's value for `Item`, or 96 without a hook.
FK_API int PPIForItem(const IPtr<IItem>& Item);

} // namespace formkit
