//===- frameworks/kiln/design/KilnDesign.h - The Kiln designer package ---===//
//
// What puts Kiln forms, frames and data modules on a design surface: the
// designer of the framework (`TKilnDesigner`, modules in ".kfm" files), its
// module on design (`TKilnRoot`), the surface that shows a root's controls and
// non-visual components (`TKilnSurface`), the items of both, and the guides
// that controls offer for snapping (`TControlGuidelines` and its descendants,
// registered as the package loads).
//
// Example:
//   StartDesignCore();
//   RegisterKilnDesignPackage();              // while the package loads
//   InitializeDesigners(Environment);         // the host, at start
//   IPtr<IComponentDesigner> Kiln = Designers()->DesignerFromExtension(".kfm");
//   IPtr<IRoot> Root = Kiln->CreateRoot(Module, "Unit1.kfm", false, "Form1", "", "", nullptr, "");
//   auto* Surface = KilnSurfaceOf(Root);
//   Surface->MouseDown(10, 10, {});            // gestures arrive as a window's input would
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesigner.h"
#include "core/root/ComponentRoot.h"
#include "core/root/RootItems.h"
#include "editors/ComponentGuidelines.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnGraphics.h"
#include "frameworks/kiln/design/DMForm.h"
#include "frameworks/kiln/design/WCtlForm.h"
#include "surface/DragBoxes.h"
#include "surface/GestureEngine.h"

namespace formkit {

class TKilnSurface;
class TKilnRoot;

/// The size of the icon of a non-visual component on a surface.
inline constexpr int KilnIconSize = 28;
/// The size of one grab handle.
inline constexpr int KilnHandleSize = 5;

//===----------------------------------------------------------------------===//
// Designer
//===----------------------------------------------------------------------===//

/// The designer of the Kiln framework: serves roots that are controls or data modules,
/// keeps its modules in files ending in ".kfm".
class FK_API TKilnDesigner : public TComponentDesigner {
  FK_CLASS(TKilnDesigner, TComponentDesigner)
  explicit TKilnDesigner(const IPtr<IDesignEnvironment>& Environment = nullptr) : TComponentDesigner(Environment) {}

  IPtr<IRoot> CreateRoot(const IPtr<IDesignerModule>& Module, const String& FileName, bool AExisting,
                         const String& AFormName, const String& AAncestorName, const String& AFileSystem,
                         const IPtr<IRoot>& AAncestorRoot, const String& AViewName) override;
  IPtr<IRoot> CreateRootFromStream(const IPtr<IDesignerModule>& Module, const String& FileName,
                                   const String& AFileSystem, const IPtr<IDatedStream>& AStream,
                                   const IPtr<IRoot>& AAncestorRoot, const String& AViewName) override;
  String GetDesignerName() override { return "Kiln"; }
  String GetDesignerExtension() override { return ".kfm"; }
  TClass GetDataModuleClass() override;
  bool SupportsRootClass(TClass RootClass) override;

  // Files: plain files of the machine; the file system name is not used.
  TStream* OpenFile(const String& FileSystem, const String& Name, int Mode) override;
  int GetFileAge(const String& FileSystem, const String& Name) override;
  bool FileExists(const String& FileSystem, const String& Name) override;
  bool RenameFile(const String& FileSystem, const String& OldName, const String& NewName) override;
  void GetTempFileName(const String& FileSystem, const String& Name, String& TempName) override;
  void GetBackupFileName(const String& FileSystem, const String& Name, String& BackupName) override;
  bool IsFileReadOnly(const String& FileSystem, const String& Name) override;
  bool DeleteFile(const String& FileSystem, const String& Name) override;
  void FileWritten(const String& FileSystem, TStream* Stream) override;

private:
  /// A master just made makes its views: those the module record brings when it is
  /// also a creator of views (a module a wizard makes), and those its view list names.
  /// A module whose views cannot be made is closed again and the failure passes on.
  IPtr<IRoot> WithViews(const IPtr<TKilnRoot>& Root, const IPtr<IDesignerModule>& Module, const String& ViewName);
};

FK_RESOURCESTRING(sKilnControlOnDataModule, "Controls cannot be added to a data module (%s)");
FK_RESOURCESTRING(sKilnNotAKilnClass, "Class %s does not belong to the Kiln framework");

/// Whether a class may stand on a Kiln module: a component that is not a form.
[[nodiscard]] FK_API bool KilnComponentClassApplies(TClass ComponentClass);
/// Raises `EComponentDesignerException` `sKilnNotAKilnClass` for a component whose
/// class `Module` refuses.
FK_API void ValidateKilnComponent(ICustomModule& Module, TComponent* Component);

/// What the framework adds to a module of forms: which classes may stand in it and
/// whether its roots nest in other modules.
class FK_API TKilnCustomModule : public TBaseCustomModule, public ICustomModule {
  FK_CLASS(TKilnCustomModule, TBaseCustomModule)
  FK_INTERFACES(ICustomModule)
  void Create(TComponent* ARoot, const IPtr<IDesigner>& ADesigner) override;
  TCustomModuleAttributes GetAttributes() override { return {}; }
  void ExecuteVerb(int) override {}
  String GetVerb(int) override { return ""; }
  int GetVerbCount() override { return 0; }
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  void Saving() override {}
  /// Raises `EComponentDesignerException` for a class that is not the framework's.
  void ValidateComponent(TComponent* Component) override { ValidateKilnComponent(*this, Component); }
  /// Kiln controls and non-visual components.
  bool ValidateComponentClass(TClass ComponentClass) override { return KilnComponentClassApplies(ComponentClass); }
  /// Forms do not nest in other modules.
  bool Nestable() override { return false; }

protected:
  TComponent* FRoot = nullptr; // the module's root; the root holds this module
};

/// Frames nest in other modules and are designed in a window around them.
class FK_API TKilnFrameModule : public TWinControlCustomModule {
  FK_CLASS(TKilnFrameModule, TWinControlCustomModule)
  void ValidateComponent(TComponent* Component) override { ValidateKilnComponent(*this, Component); }
  bool ValidateComponentClass(TClass ComponentClass) override { return KilnComponentClassApplies(ComponentClass); }
  bool Nestable() override { return true; }
};

/// A data module holds non-visual components only, shown as icons in its window.
class FK_API TKilnDataModuleModule : public TDataModuleCustomModule {
  FK_CLASS(TKilnDataModuleModule, TDataModuleCustomModule)
  /// Raises `sKilnControlOnDataModule` for a control, else as any Kiln module.
  void ValidateComponent(TComponent* Component) override;
  bool ValidateComponentClass(TClass ComponentClass) override;
};

//===----------------------------------------------------------------------===//
// Guides of controls
//===----------------------------------------------------------------------===//

FK_RESOURCESTRING(sKilnGuidelinesWrongClass, "%s serves controls of class %s, not %s");

/// The guides of a control: its edges (indices 0 to 3: left, top, right, bottom, the
/// right and bottom ones on the last pixel inside) and the outer lines of its margins (4
/// to 7), measured from the control's origin and given in the container's client
/// coordinates. On the container itself they are measured from its client area.
class FK_API TControlGuidelines : public TComponentGuidelines {
  FK_CLASS(TControlGuidelines, TComponentGuidelines)
  /// Raises `EInvalidCast` `sKilnGuidelinesWrongClass` for a component that is not a control.
  void Initialize(TComponent* AComponent, TComponent* AContainer) override;
  /// Add the position of the control's origin in the container's client area: through the
  /// parents when the container holds the control, else in the parent's client area.
  /// Nothing on the container itself.
  int CalcHorzPos(int APos) override { return APos + Origin().X; }
  int CalcVertPos(int APos) override { return APos + Origin().Y; }
  int GetCount() override { return 8; }
  /// Raises `EListError` for an index out of range.
  TDesignerGuideType GetDesignerGuideType(int Index) override;
  /// Raises `EListError` for an index out of range.
  int GetGuideOffset(int Index) override;

  TControl* Control() const noexcept { return static_cast<TControl*>(FComponent); }
  /// Where the client area starts inside the bounds on the container itself; (0, 0) on
  /// any other control.
  TPoint ClientDelta() const noexcept { return FClientDelta; }

protected:
  /// Raises `EInvalidCast` `sKilnGuidelinesWrongClass` unless `AComponent` is a `Class`.
  void RequireClass(TComponent* AComponent, TClass Class) const;
  /// `Offset`, measured from the bounds, less the client delta on the axis of `Type`.
  int FromClientDelta(TDesignerGuideType Type, int Offset) const noexcept;
  /// The control's origin in the container's client area.
  TPoint Origin() const;

  TPoint FClientDelta;
};

/// The guides of a windowed control. One that accepts child controls, and a frame, adds
/// the lines its padding draws inside its client area (8 to 11: left, top, right,
/// bottom), where the margins of its children stop.
class FK_API TWinControlGuidelines : public TControlGuidelines {
  FK_CLASS(TWinControlGuidelines, TControlGuidelines)
  /// Raises `EInvalidCast` `sKilnGuidelinesWrongClass` for a component that is not a
  /// windowed control.
  void Initialize(TComponent* AComponent, TComponent* AContainer) override;
  /// 12 with the padding guides, else 8.
  int GetCount() override;
  TDesignerGuideType GetDesignerGuideType(int Index) override;
  int GetGuideOffset(int Index) override;

  TWinControl* WinControl() const noexcept { return static_cast<TWinControl*>(FComponent); }

protected:
  bool HasPaddingGuides() const;
  /// The padding the guides are drawn by: the control's own.
  virtual TRect GuidePadding() const { return WinControl()->Padding(); }
};

/// The guides of a form: a form without padding places its padding guides 5 pixels in
/// on every side.
class FK_API TCustomFormGuidelines : public TWinControlGuidelines {
  FK_CLASS(TCustomFormGuidelines, TWinControlGuidelines)
  /// Raises `EInvalidCast` `sKilnGuidelinesWrongClass` for a component that is not a form.
  void Initialize(TComponent* AComponent, TComponent* AContainer) override;

protected:
  TRect GuidePadding() const override;
};

/// Creates the Kiln designer and registers it with `Designers`.
FK_API void InitializeKilnDesigner(const IPtr<IDesignEnvironment>& Environment);
/// What the package does when it loads: the framework's classes, its custom modules
/// (the core must run), the editor registries joined to the core, the guides of
/// controls, the pixels-per-inch hook, and its designer's initializer.
FK_API void RegisterKilnDesignPackage();

//===----------------------------------------------------------------------===//
// Module on design
//===----------------------------------------------------------------------===//

/// A Kiln module on design. A form is its own design window; a frame or a data module
/// is shown in a window the root makes for it.
class FK_API TKilnRoot : public TComponentRoot {
  FK_CLASS(TKilnRoot, TComponentRoot)

  /// The surface, or null while none is open.
  TKilnSurface* KilnSurface() const noexcept { return FKilnSurface; }

  // The user's answers while modules are read and saved ---------------------------------
  // Unset, each question goes to the user: the recovery dialogs (RecoveryDialogs.h) and
  // message dialogs on Kiln forms. A host without a person at the keyboard (a command
  // line) sets them to answer from its options instead.
  /// Answers a read error with its message.
  static inline std::function<TRootReadErrorResult(const String& Message)> ReadErrorAnswer;
  /// Answers for an inherited component the ancestor lacks; may change `NewName`.
  static inline std::function<TRecoveryResult(const String& RootName, const String& AncestorName, String& NewName,
                                              const String& Candidates, bool Nested)>
      AncestorRecoveryAnswer;
  /// Answers whether links to a missing module are to be removed or redirected.
  static inline std::function<TQueryRedirectLinksResult(const String& RootName, const String& LinkedName)>
      RedirectLinksAnswer;
  /// The module the links go to instead; empty removes them.
  static inline std::function<String(TComponent* Root, const String& LinkedName)> RedirectTarget;
  /// Answers whether reverting a component may delete its own children; `Question` is
  /// `sAncestorDeleteWarning` with the component's name and the children's.
  static inline std::function<TDeleteWarnResult(const String& Question)> DeleteWarningAnswer;
  /// The window that shows the module.
  TCustomForm* DesignWindow() const noexcept { return FWindow; }

  // Owners of controls -------------------------------------------------------------------
  /// Who owns what stands in `Parent`: the nearest nested frame above it that this module
  /// may change, or the module's root. A nested frame's insides belong to the frame, as
  /// they do when the module is read.
  TComponent* OwnerWithin(TWinControl* Parent) const;
  /// Gives a control of the module's own (not inherited) that moved into or out of a
  /// nested frame the owner its new place asks for, renamed when the new owner holds its
  /// name already; otherwise the module would not write it where it stands.
  void KeepOwnerWithParent(TControl* Control);

  // Previews of views -------------------------------------------------------------------
  /// Draws the module's form into `Bitmap`, a `TBitmap` (anything else is left as it is):
  /// sized to the form, each control a framed rectangle with its name, in paint order.
  void GetViewPreview(TPersistent* Bitmap) override;
  /// Whether the module changed since its preview was last drawn.
  bool PreviewOutOfDate() const noexcept { return FGeneratePreview; }

protected:
  void HideRootWindow() override;
  void ShowRootWindow() override;
  void ShowRootWindowAs(TShowState State) override;
  void TearDownRoot() override;
  void DestroyRootInstance(TComponent* Instance) override;
  void NewRootCreated(TComponent* Instance, const String& ClassName) override;
  void InitializeSurface() override;
  void InitRootInstance(TComponent* Instance) override;
  void InitNewRoot(TComponent* Instance, const String& ClassName) override;
  void RootInstanceReady() override;
  /// The topmost owner.
  TComponent* RootOf(TComponent* Component) override;
  /// A Kiln module does not offer its own root among its names: a reference property
  /// lists the components on the form, not the form. Other modules' roots are offered.
  bool OffersRootName() override { return false; }
  int GetControlCount(TComponent* Component) override;
  TComponent* GetControl(TComponent* Component, int Index) override;
  bool IsControl(TComponent* Component) override;
  TComponent* GetParent(TComponent* Component) override;
  void FrameComponentAdded(TComponent* Component) override;
  TRootReadErrorResult AskReadError(const String& Message) override;
  TRecoveryResult AskAncestorRecovery(const String& RootName, const String& AncestorName, String& NewName,
                                      const String& Candidates, bool Nested) override;
  TQueryRedirectLinksResult AskRedirectLinks(const String& RootName, const String& LinkedName) override;
  void RedirectLinks(TComponent* Root, const String& LinkedName) override;
  TDesignClipboard& Clipboard() override;
  /// Frames nest in forms and in other frames.
  bool CanNestClass(TClass Class) override;
  TClass GetClassGroup() override;
  TDeleteWarnResult AskDeleteWarning(const String& ComponentName, const String& Names) override;
  /// Mirrors controls right to left in their parents: every control of the form, or the
  /// children of each selected container.
  void FlipRootChildren(bool AllChildren) override;
  /// Moves a pasted control by what moves the selection's bounds to `Rect`'s top left;
  /// nothing when either is empty or the control is not on the top of the paste.
  void AdjustReadComponent(TComponent* Component, const TRect& Rect, const TRect& Bounds) override;
  /// Draws an empty frame of the bitmap's size, or of the form's when the bitmap has
  /// none, captioned with the device's name.
  void RenderViewPreview(const String& ViewName, TPersistent* Bitmap) override;

private:
  void LinkDesigner(TComponent* Instance, bool Link);
  TKilnSurface* FKilnSurface = nullptr; // owned through FSurface
  TCustomForm* FWindow = nullptr;       // the form itself, or one the root made
  TWinControl* FContainer = nullptr;    // where the components stand: in FWindow, or it
  TComponent* FWindowRoot = nullptr;    // the root the window was made for
  bool FOwnWindow = false;
};

/// The Kiln surface of a root given as `IRoot`; null for another framework's root.
FK_API TKilnSurface* KilnSurfaceOf(const IPtr<IRoot>& Root);

//===----------------------------------------------------------------------===//
// Items
//===----------------------------------------------------------------------===//

/// The item of a control: its bounds in the parent's client area, the parent's item
/// above it, its own client area for children, and the guides registered for its class.
class FK_API TKilnControlItem : public TComponentItem {
  FK_CLASS(TKilnControlItem, TComponentItem)
  FK_INTERFACES(IItemEx, IComponentItem)
  TKilnControlItem() = default;
  TKilnControlItem(TControl* Control, TKilnSurface* Surface, const IPtr<IDesigner>& Designer);

  TControl* Control() const { return static_cast<TControl*>(FInstance); }
  bool Contains(const IPtr<IItem>& Item) override;
  TPoint GlobalToLocal(const TPoint& Point) override;
  TPoint LocalToGlobal(const TPoint& Point) override;
  /// The root's item is its client area at (0, 0); any other, its bounds in its parent.
  TRect GetBoundsRect() override;
  TRect GetClientRect() override;
  IPtr<IItem> GetParent() override;
  /// A control that accepts children.
  bool IsContainer() override;
  bool HasSelectableChildren() override { return IsContainer(); }
  void SetBoundsRect(const TRect& Rect) override;
  IPtr<IItem> GetChildren(int Index) override;
  int GetChildCount() override;
  void SetParent(const IPtr<IItem>& Parent) override;
  void Show() override;
  void ZOrder(bool Front) override;
  /// The bounds with the control's margins around them; the container's own bounds.
  TRect GetPaddedBoundsRect() override;
  /// Every control takes part, the container too: its padding is where its children stop.
  bool HasGuidelines() override { return true; }
  /// The guides registered for the control's class, in the surface's coordinates.
  IPtr<IItemGuidelines> GetItemGuidelines() override;

private:
  TKilnSurface* FSurface = nullptr;
};

/// The item of a non-visual component: an icon at its design position.
class FK_API TKilnIconItem : public TComponentItem {
  FK_CLASS(TKilnIconItem, TComponentItem)
  TKilnIconItem() = default;
  TKilnIconItem(TComponent* Component, TKilnSurface* Surface, const IPtr<IDesigner>& Designer);

  TRect GetBoundsRect() override;
  IPtr<IItem> GetParent() override;
  void SetBoundsRect(const TRect& Rect) override;
  TPoint GlobalToLocal(const TPoint& Point) override { return Point; }
  TPoint LocalToGlobal(const TPoint& Point) override { return Point; }

private:
  TKilnSurface* FSurface = nullptr;
};

//===----------------------------------------------------------------------===//
// Surface
//===----------------------------------------------------------------------===//

/// The palette as the engine sees it: a tool is armed when the host says one was picked.
class FK_API TKilnTools : public TInterfacedObject, public ITools {
  FK_CLASS(TKilnTools, TInterfacedObject)
  FK_INTERFACES(ITools)
  explicit TKilnTools(TKilnRoot* Root = nullptr) : FRoot(Root) {}
  bool ToolSelected() override;

private:
  TKilnRoot* FRoot; // the root holds the engine that holds this
};

/// Grab handles on a single selected item: eight squares around it.
class FK_API TKilnGrabHandles : public TInterfacedObject, public IGrabHandles {
  FK_CLASS(TKilnGrabHandles, TInterfacedObject)
  FK_INTERFACES(IGrabHandles)
  explicit TKilnGrabHandles(TKilnSurface* Surface = nullptr) : FSurface(Surface) {}
  IPtr<IItem> GetAttachedItem() override { return FItem; }
  void AttachHandles(const IPtr<IItem>& Item) override;
  void SetHandlesActive(bool Value) override;
  bool Active() const noexcept { return FActive; }
  /// Off the handles when they are inactive.
  TMoveAffects HandleAtPoint(int X, int Y) override;
  void RefreshHandles() override;

private:
  TKilnSurface* FSurface;
  IPtr<IItem> FItem;
  bool FActive = true;
};

/// Drag boxes drawn on the surface's canvas. The guide lines of the drag go to the
/// surface's painter, so that the end of the drag takes them away.
class FK_API TKilnDragBoxes : public TXorDragBoxes, public IGuidelinePainter {
  FK_CLASS(TKilnDragBoxes, TXorDragBoxes)
  FK_INTERFACES(IGuidelinePainter)
  explicit TKilnDragBoxes(TCanvas* Canvas = nullptr, IPtr<IGuidelinePainter> Painter = nullptr)
      : FCanvas(Canvas), FPainter(std::move(Painter)) {}

  void AddGuide(const TRect& Rect, TGuideType GuideType) override {
    if (FPainter) FPainter->AddGuide(Rect, GuideType);
  }
  void BeginPaint() override {
    if (FPainter) FPainter->BeginPaint();
  }
  void ClearGuides() override {
    if (FPainter) FPainter->ClearGuides();
  }
  void EndPaint() override {
    if (FPainter) FPainter->EndPaint();
  }

protected:
  void DrawBox(const TRect& Rect, TDesignBoxStyle Style) override;

private:
  TCanvas* FCanvas;
  IPtr<IGuidelinePainter> FPainter; // the surface, for as long as the drag lasts
};

/// The surface of one Kiln module. Its design coordinates are the client area of the
/// container the components stand in (the form itself, a frame, or a data module's
/// scrolled area, whose scroll offset input is moved by); global coordinates are the
/// same. Input arrives through `MouseDown`, `MouseMove`, `MouseUp` and `KeyDown`, as
/// the window would deliver it. The surface draws the guide lines of a drag on its
/// canvas itself.
class FK_API TKilnSurface : public TDesignSurface, public IGuidelinePainter {
  FK_CLASS(TKilnSurface, TDesignSurface)
  TKilnSurface() : FCanvas(new TCanvas) {}
  TKilnSurface(TKilnRoot* Root, TWinControl* Container);
  void BeforeDestruction() override;

  // Identity: the base's, which answers `IDesigner` with the designer's interface.
  bool QueryInterface(const TGUID& IID, void** Obj) override { return inherited::QueryInterface(IID, Obj); }
  int AddRef() override { return ObjAddRef(); }
  int Release() override { return ObjRelease(); }
  void* GetInterfaceEntry(const TGUID& IID) override;

  // Input, as the design window delivers it --------------------------------------------
  void MouseDown(int X, int Y, TShiftState Shift, bool DoubleClick = false);
  void MouseMove(int X, int Y);
  void MouseUp(int X, int Y);
  void KeyDown(TDesignKeyCode Key, TShiftState Shift = {}, char Ch = 0);

  /// Where feedback is drawn: drag boxes, handles, icons.
  TCanvas* Canvas() noexcept { return FCanvas.Get(); }
  TKilnRoot* Root() const noexcept { return FKilnRoot; }
  TWinControl* Container() const noexcept { return FContainer; }
  /// The item of a component of the module.
  IPtr<IItem> ItemOf(TComponent* Component);
  /// How far a data module's area is scrolled: what input coordinates are moved by to
  /// reach the icons' positions. (0, 0) for a form or a frame, whose controls scroll.
  TPoint ScrollOffset() const;
  /// A point of the container's client area in design coordinates.
  TPoint InputPoint(int X, int Y) const;

  // IDesignSurface: what touches the window ------------------------------------------------
  IPtr<IDragBoxes> BeginDrag(const IPtr<IItem>& Parent, const TPoint& Point) override;
  /// Drops the listener and the handles; the root is gone for the surface.
  void Close() override;
  TPoint GetCursorPoint() override { return FCursor; }
  TPoint DesignToGlobal(const TPoint& Point) override { return Point; }
  /// The next (or previous) of the selectable components, around the end.
  IPtr<IItem> FindNextItem(const IPtr<IItem>& Item, bool Forward) override;
  void FocusSurface() override { FFocused = true; }
  /// The surface paints the guide lines itself.
  IPtr<IGuidelinePainter> GetGuidelinePainter() override { return IPtr<IGuidelinePainter>(this); }
  TPoint GetOrigin() override { return {0, 0}; }
  /// The container's item; made on request.
  IPtr<IItem> GetRoot() override;
  IPtr<IItem> GetContainerItem() override { return GetRoot(); }
  TPoint GlobalToDesign(const TPoint& Point) override { return Point; }
  IPtr<IItem> ItemAtPoint(int X, int Y) override;
  void ShowContextMenu() override {}
  IPtr<IItem> ItemFromComponent(TComponent* Component) override { return ItemOf(Component); }

  // IComponentDesignSurface --------------------------------------------------------------
  void UpdateSurface() override;
  void ItemRemoved(TComponent* Component) override;
  void SetOptions(const TDesignSurfaceOptions& Options) override;

  // IGuidelinePainter: each line a "MoveTo" and a "LineTo" on the canvas -----------------
  void AddGuide(const TRect& Rect, TGuideType GuideType) override;
  void BeginPaint() override {}
  void ClearGuides() override { FGuideLines.clear(); }
  void EndPaint() override {}

  const TDesignSurfaceOptions& Options() const noexcept { return FOptions; }
  bool Focused() const noexcept { return FFocused; }
  /// A guide line on show.
  struct TGuideLine {
    TRect Rect;
    TGuideType Type;
    friend bool operator==(const TGuideLine&, const TGuideLine&) = default;
  };
  /// The guide lines on show, in the order they were added.
  const std::vector<TGuideLine>& GuideLines() const noexcept { return FGuideLines; }

private:
  TKilnRoot* FKilnRoot = nullptr;       // the root holds this surface
  TWinControl* FContainer = nullptr; // where the module's components stand
  IPtr<TKilnGrabHandles> FHandles;   // also the base's grab handles
  TObjectGuard<TCanvas> FCanvas;
  std::vector<TGuideLine> FGuideLines;
  TDesignSurfaceOptions FOptions;
  TPoint FCursor;
  bool FFocused = false;
};

} // namespace formkit
