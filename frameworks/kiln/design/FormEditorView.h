//===- frameworks/kiln/design/FormEditorView.h - The "Design" sub-view ---===//
//
// The sub-view "Design" of an editor tab (`TFormEditorView`): for a tab whose
// module has objects to design, the host makes a `TEditorFormDesigner` frame and
// the sub-view asks the framework wrappers (`TEditorFormDesignerWrapper`) to
// show the module's designer in it. Each frame remembers the module it last
// showed in a context cache item that follows the module's life (a module
// notifier) and the frame's (free notification), so that a tab left without a
// module still hides the right designer. `InternalRegister` makes the one
// sub-view and registers it; `InternalUnRegister` undoes that.
//
// Example:
//   class TKilnWrapper : public TEditorFormDesignerWrapper { ... };   // a framework's
//   InternalRegister();
//   FormEditorView()->Display(Module, Frame);   // the module's designer in the frame
//   InternalUnRegister();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/design/EditorViewSupport.h"

#include <functional>

namespace formkit {

class TEditorFormDesigner;
class TEvent;
class TContextCacheItem;
class TFormEditorView;

FK_RESOURCESTRING(sFormEditorViewCaption, "Design");
/// The identifier under which the host remembers the sub-view.
inline constexpr const char* FormDesignerViewIdentifier = "Halvern.FormDesignerView";
/// The kind of tree the structure view shows for a designed module.
inline constexpr const char* DesignerStructureType = "Designer.StructureType";

//===----------------------------------------------------------------------===//
// Framework wrappers
//===----------------------------------------------------------------------===//

/// How a framework's designer shows itself in an editor frame. A framework subclasses it;
/// each wrapper joins a global list as it is made and leaves it as it goes.
class FK_API TEditorFormDesignerWrapper : public TObject {
  FK_CLASS(TEditorFormDesignerWrapper, TObject)
  TEditorFormDesignerWrapper();
  void BeforeDestruction() override;

  /// The class name of the roots the wrapper designs.
  virtual String GetRootClassName() = 0;
  /// Shows the designer in `ViewObject`, a `TEditorFormDesigner`.
  virtual void DisplayDesigner(TObject* ViewObject) = 0;
  /// The wrapper of the designer active now: this one or one the framework holds.
  virtual TEditorFormDesignerWrapper* GetActiveDesignerWrapper() = 0;
  /// Takes the designer out of its frame.
  virtual void HideDesigner() = 0;
  /// Whether the wrapper designs `Module`.
  virtual bool IsModule(const IPtr<IOTAModule>& Module) = 0;
  /// Whether the wrapper's designer stands in `ViewObject`.
  virtual bool IsChildView(TObject* ViewObject) = 0;
  virtual TEditState GetEditState() = 0;
  virtual bool EditAction(TEditAction Action) = 0;
  /// What the structure view shows for the designer; null for nothing.
  virtual IPtr<IInterface> GetStructureViewContext() = 0;

  /// Whether the frame shows the view selector for this designer; false at first.
  bool Multiview() const noexcept { return FMultiview; }
  void SetMultiview(bool Value) noexcept { FMultiview = Value; }
  /// The context last given to the view object that shows this wrapper (`SetViewContext`).
  const IPtr<IInterface>& Context() const noexcept { return FContext; }
  void SetContext(const IPtr<IInterface>& Value) { FContext = Value; }

  /// The first wrapper of the list for which `Predicate` is true; null when none (or no
  /// list).
  [[nodiscard]] static TEditorFormDesignerWrapper* FindWrapper(
      const std::function<bool(TEditorFormDesignerWrapper*)>& Predicate);
  /// Whether the list has been made (and not freed since).
  [[nodiscard]] static bool WrapperListExists() noexcept;
  /// Frees the list; wrappers made afterwards start a new one.
  static void FreeWrapperList() noexcept;

protected:
  bool FMultiview = false;

private:
  IPtr<IInterface> FContext;
};

/// Gives `ViewObject`'s wrapper (through `IGetEditorFormDesignerWrapper`) the context.
FK_API void SetViewContext(const IPtr<IInterface>& Context, TObject* ViewObject);

//===----------------------------------------------------------------------===//
// The context cache
//===----------------------------------------------------------------------===//

/// Told by a module of its end; clears its cache item's context.
class FK_API TModuleNotifier : public TInterfacedObject, public IOTAModuleNotifier {
  FK_CLASS(TModuleNotifier, TInterfacedObject)
  FK_INTERFACES(IOTAModuleNotifier)
  TModuleNotifier() = default;
  explicit TModuleNotifier(TContextCacheItem* Item) : FItem(Item) {}

  void AfterSave() override {}
  void BeforeSave() override {}
  void Destroyed() override;
  void Modified() override {}
  bool CheckOverwrite() override { return true; }
  void ModuleRenamed(const String&) override {}

private:
  friend class TContextCacheItem;
  TContextCacheItem* FItem = nullptr; // plain back reference, cleared by the item
};

/// The module a view object last showed. A component of its sub-view's cache; it frees
/// itself when its view object, a component, goes away.
class FK_API TContextCacheItem : public TComponent {
  FK_CLASS(TContextCacheItem, TComponent)
  void BeforeDestruction() override;

  TObject* ViewObject() const noexcept { return FViewObject; }
  /// Watches `Value` for its end when it is a component.
  void SetViewObject(TObject* Value);
  const IPtr<IOTAModule>& Context() const noexcept { return FContext; }
  /// Detaches the notifier of the module held, then holds `Value` with a notifier of its
  /// own attached.
  void SetContext(const IPtr<IOTAModule>& Value);
  /// The handle of the notifier on the module; -1 when none is attached.
  int NotifierIndex() const noexcept { return FNotifierIndex; }

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  friend class TModuleNotifier;
  friend class TFormEditorView;
  void DetachNotifier() noexcept;
  TObject* FViewObject = nullptr;
  IPtr<IOTAModule> FContext;
  int FNotifierIndex = -1;
  IPtr<TModuleNotifier> FNotifier;      // also held by the module while attached
  TFormEditorView* FCache = nullptr;    // the sub-view whose cache lists the item
};

//===----------------------------------------------------------------------===//
// The sub-view
//===----------------------------------------------------------------------===//

/// The sub-view "Design": shows a module's designer in a `TEditorFormDesigner` frame.
class FK_API TFormEditorView : public TCustomEditorView,
                               public IOTACustomEditorSubViewStructure,
                               public IInternalNotifyClosing {
  FK_CLASS(TFormEditorView, TCustomEditorView)
  FK_INTERFACES(IOTACustomEditorSubViewStructure, IInternalNotifyClosing)
  void BeforeDestruction() override;

  String GetCaption() override;
  String GetViewIdentifier() override { return FormDesignerViewIdentifier; }
  int GetPriority() override { return -255; }
  TClass GetFrameClass() override;
  String GetStructureType() override { return DesignerStructureType; }
  /// True when the context answers `IOTAModuleData` and that has objects.
  bool Handles(const IPtr<IInterface>& Context) override;
  /// Brings the module's designer back from dormancy and shows it through its wrapper, or,
  /// without a module, hides the designer the frame showed last.
  void Display(const IPtr<IInterface>& Context, TObject* ViewObject) override;
  bool EditAction(const IPtr<IInterface>& Context, TEditAction Action, TObject* ViewObject) override;
  TEditState GetEditState(const IPtr<IInterface>& Context, TObject* ViewObject) override;
  IPtr<IInterface> GetStructureContext(const IPtr<IInterface>& Context, TObject* ViewObject) override;
  void SetClosing(bool Value) override { FClosingNotifier = Value; }

  /// The active wrapper of the wrapper that shows `Context`'s module (or, without a
  /// module, stands in `ViewObject`); null unless `ViewObject` is a `TEditorFormDesigner`.
  [[nodiscard]] TEditorFormDesignerWrapper* GetContainerForm(const IPtr<IInterface>& Context, TObject* ViewObject);

  // The context cache ---------------------------------------------------------------------
  /// The module `ViewObject` last showed, or null.
  [[nodiscard]] IPtr<IOTAModule> GetCachedContext(TObject* ViewObject) const;
  [[nodiscard]] TContextCacheItem* GetContextCacheItem(TObject* ViewObject) const;
  /// Remembers `Context` (null forgets) as the module `ViewObject` shows.
  void SetCachedContext(const IPtr<IInterface>& Context, TObject* ViewObject);
  int CachedContextCount() const noexcept { return static_cast<int>(FCachedContexts.size()); }

private:
  friend class TContextCacheItem;
  std::vector<TContextCacheItem*> FCachedContexts; // owned
  bool FClosingNotifier = false;
};

//===----------------------------------------------------------------------===//
// The unit's state
//===----------------------------------------------------------------------===//

/// Sent with the frame whose designer was hidden because its tab has no module.
FK_API extern TEvent* EvDesignerHidden;

/// Makes the one sub-view (and `EvDesignerHidden`) and registers it. A repeat does nothing.
FK_API void InternalRegister();
/// Unregisters and drops the sub-view, frees the list of wrappers and `EvDesignerHidden`.
FK_API void InternalUnRegister() noexcept;
/// The registered sub-view; null outside `InternalRegister` .. `InternalUnRegister`.
FK_API TFormEditorView* FormEditorView() noexcept;

} // namespace formkit
