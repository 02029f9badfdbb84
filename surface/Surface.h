//===- surface/Surface.h - The base of a framework's design surface -------===//
//
// `TDesignSurface` keeps what every surface keeps (its listener, root, items of
// the root and the container, grab handles, guide painter, options, owned
// helpers) and forwards what only the module knows to its host, the root as a
// surface sees it (`ISurfaceHost`). What touches real windows (hit testing,
// coordinates, drag feedback, focus, context menus) stays abstract: a
// framework's surface writes it.
//
// Example:
//   class TMySurface : public TDesignSurface {
//     FK_CLASS(TMySurface, TDesignSurface)
//     IPtr<IItem> ItemAtPoint(int X, int Y) override { ... }   // and the other abstract ones
//   };
//   Surface->Create(Root->AsDesigner(), Root->Root(), Root->AsSurfaceHost());
//   Surface->DeleteSelection();   // the host deletes its selection
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "surface/Designer.h"

#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// What a surface asks of the module, and what the module asks of its surface
//===----------------------------------------------------------------------===//

/// The module as its surface sees it; the concrete root of a framework answers it.
struct FK_API ISurfaceHost : IInterface {
  FK_INTERFACE(ISurfaceHost, IInterface, "{5DAEC2D5-5746-4DAD-ABD0-61ED54BFFF25}")
  /// Shows one of the host's design dialogs for the selection.
  virtual void Dialog(TDesignDialog Kind) = 0;
  /// Runs one of the module's design commands.
  virtual void Command(TDesignCommand Kind) = 0;
  /// Deletes the selected components.
  virtual void DeleteSelection() = 0;
  /// Reports a change of the module.
  virtual void Modified() = 0;
  /// Raises when the module must not change.
  virtual void ValidateModification() = 0;
  /// A name unique in the module, made from `BaseName`.
  virtual String UniqueName(const String& BaseName) = 0;
  /// Raises when `Component` must not be inserted into the module.
  virtual void CanInsertComponent(TComponent* Component) = 0;
  /// `Instance` joined the module.
  virtual void InstanceInserted(TPersistent* Instance) = 0;
  /// `Instance` left the module.
  virtual void InstanceRemoved(TPersistent* Instance) = 0;
  /// The components a user can select on the surface: the module's, then those of its
  /// nested roots.
  virtual int GetSelectableComponentCount() = 0;
  /// One of those; raises `EListError` outside 0 to count - 1.
  virtual TComponent* GetSelectableComponents(int Index) = 0;
};

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

/// What the framework's controls tell the surface they stand on.
struct FK_API IDesignSurfaceNotify : IInterface {
  FK_INTERFACE(IDesignSurfaceNotify, IInterface, "{B971E807-E3A6-11D1-AAB1-00C04FB16FBC}")
  virtual void Modified() = 0;
  /// `AnObject` joins (`opInsert`) or leaves (`opRemove`) the module.
  virtual void Notification(TPersistent* AnObject, TOperation Operation) = 0;
  /// Raises when `Component` must not be inserted.
  virtual void CanInsertComponent(TComponent* Component) = 0;
};

//===----------------------------------------------------------------------===//
// TDesignSurface
//===----------------------------------------------------------------------===//

/// The base of a framework's surface. It answers `IDesigner` with its designer's
/// interface. The designer and the host are counted references that the root breaks
/// when it drops the surface; the root component is not owned.
class FK_API TDesignSurface : public TInterfacedObject, public IComponentDesignSurface, public IDesignSurfaceNotify {
  FK_CLASS(TDesignSurface, TInterfacedObject)

  /// Binds the surface to its module: the designer it creates through, the designed
  /// root, and the host it forwards to.
  virtual void Create(const IPtr<IDesigner>& Designer, TComponent* Root, const IPtr<ISurfaceHost>& Host);
  /// Frees the owned helpers, the last one first.
  void BeforeDestruction() override;

  /// `IDesigner` and its ancestors (not `IInterface`) come from the designer; the rest
  /// from the surface. A descendant that adds interfaces overrides `GetInterfaceEntry`
  /// only, so that this delegation stays.
  bool QueryInterface(const TGUID& IID, void** Obj) override;
  int AddRef() override { return ObjAddRef(); }
  int Release() override { return ObjRelease(); }
  void* GetInterfaceEntry(const TGUID& IID) override;

  // Listener -----------------------------------------------------------------------------
  /// Keeps `Listener`; a second call replaces the first.
  void AddListener(const IPtr<IDesignSurfaceListener>& Listener) override { FListener = Listener; }
  /// Clears the listener, whatever `Listener` is.
  void RemoveListener(const IPtr<IDesignSurfaceListener>& Listener) override;

  // What the base answers itself ----------------------------------------------------------
  /// Drops the grab handles.
  void Close() override;
  /// Creates the host's armed tool under the parent's component through the designer, and
  /// answers its item.
  IPtr<IItem> CreateItem(const IPtr<IItem>& Parent, const TRect& Rect, bool Scaled) override;
  void DeleteSelection() override;
  /// Deletes what the item stands for.
  void DestroyItem(const IPtr<IItem>& Item) override;
  IPtr<IGrabHandles> GetGrabHandles() override { return FGrabHandles; }
  IPtr<IGuidelinePainter> GetGuidelinePainter() override { return FGuidelinePainter; }
  IPtr<IItem> GetRoot() override { return FRootItem; }
  IPtr<IItem> GetContainerItem() override { return FContainerItem; }
  /// The host's selectable components, as items. Each call makes the item anew.
  IPtr<IItem> GetItems(int Index) override;
  int GetItemsCount() override;
  /// False: a surface snaps to its grid unless it says otherwise.
  bool GridSnapDisabled() override { return false; }
  void ValidateModification() override;
  void Modified() override;
  /// Whether `Item` or an ancestor of it below the container item is selected; the
  /// container item itself is never asked.
  bool ItemInSelections(const IPtr<ISelections>& Selections, const IPtr<IItem>& Item) override;

  // What the root asks (defaults a framework refines) ------------------------------------
  void UpdateSurface() override {}
  void RefreshItems() override {}
  void BeforeRootModified() override {}
  void ItemRemoved(TComponent*) override {}
  /// Keeps the grid and the options for display.
  void SetOptions(const TDesignSurfaceOptions& Options) override;
  void SetInitializing(bool Value) override { FInitializing = Value; }

  // Forwards to the host ----------------------------------------------------------------
  void CanInsertComponent(TComponent* Component) override;
  void Notification(TPersistent* AnObject, TOperation Operation) override;
  void InstanceInserted(TPersistent* Instance);
  void InstanceRemoved(TPersistent* Instance);
  [[nodiscard]] String UniqueName(const String& BaseName);

  // Small answers -----------------------------------------------------------------------
  virtual bool GetIsControl() { return false; }
  virtual void SetIsControl(bool) {}
  virtual bool IsView() { return false; }
  /// Keeps `Host` when it differs from the one held.
  void SetHost(const IPtr<ISurfaceHost>& Host);
  TComponent* GetDesignRoot() const noexcept { return FRoot; }
  /// A verb of a selection editor was chosen; nothing in the base.
  virtual void SelectionVerb(TObject* Sender);

  // Menu handlers: each one a dialog or a command of the host ---------------------------
  void AlignToGrid(TObject* Sender);
  void AppFlipChildrenAll(TObject* Sender);
  void AppFlipChildrenSelected(TObject* Sender);
  void AppTextLYT(TObject* Sender);
  void AppViewAsText(TObject* Sender);
  void RevertComponent(TObject* Sender);
  void AppShowNonVisualComponents(TObject* Sender);
  void AppAlignDialog(TObject* Sender);
  void AppSizeDialog(TObject* Sender);
  void AppScaleDialog(TObject* Sender);
  void AppTabOrderDialog(TObject* Sender);
  void AppCreationOrderDialog(TObject* Sender);
  void AppSaveTemplateDialog(TObject* Sender);

  // State -------------------------------------------------------------------------------
  const IPtr<IDesignSurfaceListener>& Listener() const noexcept { return FListener; }
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }
  const IPtr<ISurfaceHost>& Host() const noexcept { return FHost; }
  TPoint GridSize() const noexcept { return FGridSize; }
  bool DisplayGrid() const noexcept { return FDisplayGrid; }
  bool ShowCaptions() const noexcept { return FShowCaptions; }
  bool ShowNonVisualComponents() const noexcept { return FShowNonVisualComponents; }
  bool Initializing() const noexcept { return FInitializing; }
  /// Hands `Helper` to the surface, which frees it, the last one handed first, as it dies.
  template <class T> T* AddContainer(TObjectGuard<T> Helper) {
    T* Result = Helper.Get();
    FContainers.emplace_back(std::move(Helper));
    return Result;
  }
  int ContainerCount() const noexcept { return static_cast<int>(FContainers.size()); }

protected:
  IPtr<IDesignSurfaceListener> FListener;
  TComponent* FRoot = nullptr; // not owned: the designed root
  IPtr<IItem> FRootItem;
  IPtr<IItem> FContainerItem;
  IPtr<IGrabHandles> FGrabHandles;
  IPtr<IDesigner> FDesigner;
  IPtr<ISurfaceHost> FHost;
  IPtr<IGuidelinePainter> FGuidelinePainter;
  TPoint FGridSize{8, 8};
  bool FDisplayGrid = true;
  bool FShowCaptions = false;
  bool FShowNonVisualComponents = true;
  bool FInitializing = false;

private:
  std::vector<TObjectGuard<TObject>> FContainers;
};

} // namespace formkit
