//===- frameworks/kiln/design/EditorViewSupport.h - Registry of editor sub-views ===//
//
// The sub-views a package adds to the tabs of the host's code editor, kept in
// one list made at first use (`RegisteredEditorSubViews`); the base of sub-views
// with the plain answers; and the functions that go from an editor tab's context
// (its module) to the module's form editor, designer, root component and files.
// The host hears each sub-view registered and unregistered through the two
// procedure variables it fills. A package's entries go with its group.
//
// Example:
//   void* Handle = RegisterEditorSubView(MySubView);   // the host's procedure hears it
//   IPtr<IDesigner> Designer;
//   if (ContextToDesigner(Context, Designer)) Designer->GetRoot();
//   UnregisterEditorSubView(Handle);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/design/EditorViewIntf.h"

#include "platform/Classes.h"

#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// The registry
//===----------------------------------------------------------------------===//

/// One registered sub-view: a frame class, or a sub-view object that names its frame
/// class when asked. Owned by its list.
class FK_API TCustomEditorViewInfo : public TObject {
  FK_CLASS(TCustomEditorViewInfo, TObject)
  TCustomEditorViewInfo() = default;
  TCustomEditorViewInfo(TClass ViewClass, IPtr<INTACustomEditorSubView> SubView);

  /// The frame class; without one given, the sub-view's `GetFrameClass`, asked once.
  TClass GetViewClass();
  const IPtr<INTACustomEditorSubView>& CustomEditorSubView() const noexcept { return FCustomEditorSubView; }
  /// The package group that was loading when the entry was made.
  int Group() const noexcept { return FGroup; }

private:
  TClass FViewClass = nullptr;
  IPtr<INTACustomEditorSubView> FCustomEditorSubView;
  int FGroup = -1;
};

/// The registered sub-views, in the order of registration. Owns its entries.
class FK_API TCustomEditorViewList : public TObject {
  FK_CLASS(TCustomEditorViewList, TObject)
  void BeforeDestruction() override;

  /// Adds an entry for a frame class; gives the entry as the handle.
  void* Add(TClass ViewClass);
  /// Adds an entry for `SubView` and tells `RegisterCustomEditorViewProc` after; gives the
  /// entry as the handle. Raises `EArgumentException` for a null sub-view.
  void* Add(const IPtr<INTACustomEditorSubView>& SubView);
  /// Removes every entry of `ViewClass`, from the end.
  void Remove(TClass ViewClass);
  /// Removes the entry `Handle`, telling `UnregisterCustomEditorViewProc` first; nothing
  /// for a handle that is not in the list.
  void Remove(void* Handle);
  int Count() const noexcept { return static_cast<int>(FList.size()); }
  /// The sub-view of entry `Index` (null for an entry of a frame class alone); raises
  /// `EListError` for an index outside the list.
  IPtr<INTACustomEditorSubView> GetCustomEditorView(int Index) const;
  /// The sub-view of entry `Index` as `INTAFileCustomEditorSubView`; null when it is none.
  IPtr<INTAFileCustomEditorSubView> GetFileCustomEditorView(int Index) const;
  /// The frame class of entry `Index`.
  TClass GetViewClass(int Index) const;
  /// Removes every entry of `Group`, from the end, as its package goes away.
  void FreeEditorGroup(int Group);

private:
  TCustomEditorViewInfo* Entry(int Index) const;
  void Delete(std::size_t Index) noexcept;
  std::vector<TCustomEditorViewInfo*> FList; // owned
};

/// Told of a sub-view object after it was registered, and before it is unregistered;
/// the host fills them. Null: nobody is told.
using TCustomEditorViewProc = void (*)(const IPtr<INTACustomEditorSubView>& SubView);
FK_API extern TCustomEditorViewProc RegisterCustomEditorViewProc;
FK_API extern TCustomEditorViewProc UnregisterCustomEditorViewProc;

/// The list, made at first use; a package's group goes from it as the package unloads.
FK_API TCustomEditorViewList* RegisteredEditorSubViews();
/// Adds `SubView` to the list; the handle is for `UnregisterEditorSubView`.
[[nodiscard]] FK_API void* RegisterEditorSubView(const IPtr<INTACustomEditorSubView>& SubView);
/// Removes the entry `Handle`; nothing when the list was never made.
FK_API void UnregisterEditorSubView(void* Handle);
/// Frees the list and its entries (the unit's end); the next use makes a new one.
FK_API void FreeRegisteredEditorSubViews() noexcept;

//===----------------------------------------------------------------------===//
// The base of sub-views
//===----------------------------------------------------------------------===//

/// A sub-view with the plain answers: clonable, no caption, no frame, handles nothing,
/// last in priority. Dies with its last reference.
class FK_API TCustomEditorView : public TInterfacedObject,
                                 public INTACustomEditorSubView190,
                                 public IEditorSubViewOperations {
  FK_CLASS(TCustomEditorView, TInterfacedObject)
  FK_INTERFACES(INTACustomEditorSubView190, IEditorSubViewOperations)

  bool GetCanCloneView() override { return true; }
  String GetCaption() override { return ""; }
  int GetPriority() override { return 2147483647; }
  String GetViewIdentifier() override { return ""; }
  void Display(const IPtr<IInterface>&, TObject*) override {}
  void FrameCreated(TObject*) override {}
  void Hide(const IPtr<IInterface>&, TObject*) override {}
  void ViewClosed(const IPtr<IInterface>&, TObject*) override {}
  bool EditAction(const IPtr<IInterface>&, TEditAction, TObject*) override { return false; }
  TEditState GetEditState(const IPtr<IInterface>&, TObject*) override { return {}; }
  TClass GetFrameClass() override { return nullptr; }
  bool Handles(const IPtr<IInterface>&) override { return false; }
};

//===----------------------------------------------------------------------===//
// From an editor tab's context to the module
//===----------------------------------------------------------------------===//
// Each gives false, and a null or empty result, when a step fails.

/// The context as `IOTAModule`.
FK_API bool ContextToModule(const IPtr<IInterface>& Context, IPtr<IOTAModule>& Module);
/// The first of the module's editors that answers `IOTAFormEditor`.
FK_API bool ContextToFormEditor(const IPtr<IInterface>& Context, IPtr<IOTAFormEditor>& FormEditor);
/// The form editor's designer, through `INTAFormEditor`.
FK_API bool ContextToDesigner(const IPtr<IInterface>& Context, IPtr<IDesigner>& Designer);
/// The designer's root component; false when it is null (a dormant module).
FK_API bool ContextToRootComponent(const IPtr<IInterface>& Context, TComponent*& Root);
/// The file name of the form editor.
FK_API bool ContextToFormFilename(const IPtr<IInterface>& Context, String& Name);
/// The file name of the module.
FK_API bool ContextToFilename(const IPtr<IInterface>& Context, String& Name);
/// Brings the module's dormant designer back; true when it was dormant.
FK_API bool ContextResurrect(const IPtr<IInterface>& Context);

} // namespace formkit
