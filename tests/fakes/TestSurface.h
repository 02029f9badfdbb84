//===- tests/fakes/TestSurface.h - A headless design surface --------------===//
//
// A surface that behaves as a framework's would, without a screen: controls
// are components with bounds in their parent's client coordinates; items are
// built fresh on every request and compare by the control they stand for;
// coordinates convert by summing the offsets of the parents; the grid passes
// through a settable origin; guide lines, grab handles and drag boxes are
// recorded (the boxes derive from the real XOR drag-box class, so the
// bookkeeping under test is the real one); `ValidateModification` can be made
// to refuse. What the surface is asked goes into `Log`, one line a call.
//
// The definitions are in tests/fakes/TestSurface.cpp, in the test-support library
// with the other fakes.
//
// Example:
//   IPtr<TTestSurface> S = New<TTestSurface>();
//   TTestControl* Panel = S->AddControl(nullptr, "Panel1", Bounds(16, 16, 200, 100), true);
//   IPtr<TDesigner> D = New<TDesigner>(IPtr<IDesignSurface>(S), nullptr, nullptr);
//   S->Listener->MouseDown(S->ItemOf(Panel), {}, 20, 20, false, {}, false);
//   ...
//   D->Close();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "surface/GestureEngine.h"
#include "tests/fakes/CallLog.h"

#include <map>
#include <tuple>

namespace formkit::fakes {

class TTestSurface;

/// A control on the test surface. Owned by the surface's root control.
class TTestControl : public TComponent {
  FK_CLASS(TTestControl, TComponent)

  TTestControl* Parent = nullptr;
  /// In the parent's client coordinates.
  TRect Bounds;
  /// Where the client area starts within the bounds (a border on every side).
  TPoint ClientOffset;
  /// Left, top, right, bottom.
  TRect Margins;
  TRect Padding;
  /// The text baseline from the top; -1 for none.
  int Baseline = -1;
  bool Container = false;
  bool IsSelectable = true;
  bool IsDragSelectable = true;
  bool SelectableChildren = true;
  /// The item answers to the guide and drag-image interface.
  bool Extended = true;
  bool Guidelines = true;
  /// The item is handed to the drag boxes as a whole.
  bool Whole = false;
  int Edits = 0;

  TComponent* GetParentComponent() override { return Parent; }
  bool HasParent() override { return Parent != nullptr; }
  /// (0, 0, client width, client height).
  TRect ClientRect() const;
};

/// The guides of a control, in the container's coordinates, in the order of a
/// framework's control guides: edges, margins, padding for containers, baseline.
class TTestGuidelines : public TInterfacedObject, public IItemGuidelines {
  FK_CLASS(TTestGuidelines, TInterfacedObject)
  FK_INTERFACES(IItemGuidelines)
  int GetCount() override { return static_cast<int>(Guides.size()); }
  TGuideType GetDesignerGuideType(int Index) override { return Guides.at(Index).first; }
  int GetDesignerGuideOffset(int Index) override { return Guides.at(Index).second; }
  std::vector<std::pair<TGuideType, int>> Guides;
};

/// The item of one control. Made anew on every request.
class TTestItem : public TPersistentItem {
  FK_CLASS(TTestItem, TPersistentItem)
  TTestItem() = default;
  TTestItem(TTestSurface* Surface, TTestControl* Control) : TPersistentItem(Control), FSurface(Surface) {}
  void* GetInterfaceEntry(const TGUID& IID) override;

  TTestControl* Control() const { return static_cast<TTestControl*>(FInstance); }
  bool Contains(const IPtr<IItem>& Item) override;
  void Delete() override;
  TPoint GlobalToLocal(const TPoint& Point) override;
  TPoint LocalToGlobal(const TPoint& Point) override;
  TRect GetBoundsRect() override { return Control()->Bounds; }
  TRect GetClientRect() override { return Control()->ClientRect(); }
  IPtr<IItem> GetParent() override;
  bool IsContainer() override { return Control()->Container; }
  bool HasSelectableChildren() override { return Control()->SelectableChildren; }
  void SetBoundsRect(const TRect& Rect) override;
  bool Selectable() override { return Control()->IsSelectable; }
  void Edit() override;
  bool DragSelectable() override { return Control()->IsDragSelectable; }
  IPtr<IItemGuidelines> GetItemGuidelines() override;
  TRect GetPaddedBoundsRect() override;
  bool HasGuidelines() override { return Control()->Guidelines; }

private:
  TTestSurface* FSurface = nullptr; // the surface outlives its items' use
};

/// Records the guide lines it is given; `Lines` is what is on show.
class TRecordingPainter : public TInterfacedObject, public IGuidelinePainter {
  FK_CLASS(TRecordingPainter, TInterfacedObject)
  FK_INTERFACES(IGuidelinePainter)
  struct TLine {
    TRect Rect;
    TGuideType Type;
    friend bool operator==(const TLine&, const TLine&) = default;
  };
  void AddGuide(const TRect& Rect, TGuideType GuideType) override { Lines.push_back({Rect, GuideType}); }
  void BeginPaint() override { ++Begins; }
  void ClearGuides() override {
    Lines.clear();
    ++Clears;
  }
  void EndPaint() override { ++Ends; }
  std::vector<TLine> Lines;
  int Begins = 0, Clears = 0, Ends = 0;
};

/// Records where the handles are: "AttachHandles(Name)", "AttachHandles(nil)", "RefreshHandles".
class TRecordingGrabHandles : public TInterfacedObject, public IGrabHandles {
  FK_CLASS(TRecordingGrabHandles, TInterfacedObject)
  FK_INTERFACES(IGrabHandles)
  explicit TRecordingGrabHandles(TCallLog* Log = nullptr) : FLog(Log) {}
  IPtr<IItem> GetAttachedItem() override { return Attached; }
  void AttachHandles(const IPtr<IItem>& Item) override;
  void SetHandlesActive(bool Value) override {
    if (FLog) FLog->Add(Value ? "SetHandlesActive(True)" : "SetHandlesActive(False)");
  }
  TMoveAffects HandleAtPoint(int, int) override { return {}; }
  void RefreshHandles() override {
    if (FLog) FLog->Add("RefreshHandles");
  }
  IPtr<IItem> Attached;

private:
  TCallLog* FLog;
};

/// Drag boxes that record each draw and keep the XOR parity of every drawn box, so a
/// test sees what is on screen. They show guide lines through the surface's painter.
class TTestDragBoxes : public TXorDragBoxes, public IGuidelinePainter {
  FK_CLASS(TTestDragBoxes, TXorDragBoxes)
  FK_INTERFACES(IGuidelinePainter)
  TTestDragBoxes() = default;
  explicit TTestDragBoxes(TTestSurface* Surface) : FSurface(Surface) {}

  void CancelDrag() override { Draws.push_back("CancelDrag"); }
  void AddGuide(const TRect& Rect, TGuideType GuideType) override;
  void BeginPaint() override;
  void ClearGuides() override;
  void EndPaint() override;

  /// The boxes drawn an odd number of times: what is on screen.
  std::vector<TRect> Visible() const;
  /// "Draw(l,t,r,b,style)" for each draw; "Image" is appended for a box with an image.
  std::vector<String> Draws;

protected:
  void DrawBox(const TRect& Rect, TDesignBoxStyle Style) override;
  void DrawBox(const TRect& Rect, const IPtr<IDragImage>& Image, TDesignBoxStyle Style) override;

private:
  TTestSurface* FSurface = nullptr;
  std::map<std::tuple<int, int, int, int, int>, int> FParity;
};

/// A palette whose tool a test arms.
class TTestTools : public TInterfacedObject, public ITools {
  FK_CLASS(TTestTools, TInterfacedObject)
  FK_INTERFACES(ITools)
  bool ToolSelected() override { return Armed; }
  bool Armed = false;
};

/// The surface. `Root` is the designed form; other controls are added under it.
class TTestSurface : public TInterfacedObject, public IDesignSurface {
  FK_CLASS(TTestSurface, TInterfacedObject)
  FK_INTERFACES(IDesignSurface)

  TTestSurface();
  void BeforeDestruction() override;

  /// A new control under `Parent` (the root for null), last in the surface's order.
  TTestControl* AddControl(TTestControl* Parent, const String& Name, const TRect& Bounds,
                           bool Container = false);
  /// A fresh item for `Control`.
  IPtr<IItem> ItemOf(TTestControl* Control);
  /// The control's client origin in global coordinates.
  TPoint ClientOrigin(const TTestControl* Control) const;
  TTestControl* ControlOf(const IPtr<IItem>& Item) const;
  /// The name of the control behind an item, or "nil".
  static String NameOf(const IPtr<IItem>& Item);

  // IDesignSurface
  void AddListener(const IPtr<IDesignSurfaceListener>& L) override { Listener = L; }
  IPtr<IDragBoxes> BeginDrag(const IPtr<IItem>& Parent, const TPoint& Point) override;
  void Close() override { Log.Add("Close"); }
  IPtr<IItem> CreateItem(const IPtr<IItem>& Parent, const TRect& Rect, bool Scaled) override;
  TPoint GetCursorPoint() override { return CursorPoint; }
  void DeleteSelection() override { Log.Add("DeleteSelection"); }
  TPoint DesignToGlobal(const TPoint& P) override { return {P.X + Scroll.X, P.Y + Scroll.Y}; }
  void DestroyItem(const IPtr<IItem>& Item) override { Log.Add("DestroyItem(" + NameOf(Item) + ")"); }
  IPtr<IItem> FindNextItem(const IPtr<IItem>& Item, bool Forward) override;
  void FocusSurface() override { Log.Add("FocusSurface"); }
  IPtr<IGrabHandles> GetGrabHandles() override { return IPtr<IGrabHandles>(Handles); }
  IPtr<IGuidelinePainter> GetGuidelinePainter() override {
    return ShowGuides ? IPtr<IGuidelinePainter>(Painter) : nullptr;
  }
  IPtr<IItem> GetItems(int Index) override { return ItemOf(Controls.at(Index)); }
  int GetItemsCount() override { return static_cast<int>(Controls.size()); }
  TPoint GetOrigin() override { return Origin; }
  IPtr<IItem> GetRoot() override { return ItemOf(Root); }
  IPtr<IItem> GetContainerItem() override { return ItemOf(Root); }
  TPoint GlobalToDesign(const TPoint& P) override { return {P.X - Scroll.X, P.Y - Scroll.Y}; }
  bool GridSnapDisabled() override { return GridDisabled; }
  IPtr<IItem> ItemAtPoint(int X, int Y) override;
  void RemoveListener(const IPtr<IDesignSurfaceListener>& L) override {
    if (Listener == L) Listener = nullptr;
  }
  void ShowContextMenu() override { Log.Add("ShowContextMenu"); }
  void ValidateModification() override;
  void Modified() override { Log.Add("Modified"); }
  bool ItemInSelections(const IPtr<ISelections>& Selections, const IPtr<IItem>& Item) override;
  IPtr<IItem> ItemFromComponent(TComponent* Component) override;

  TCallLog Log;
  TTestControl* Root = nullptr;
  /// Every control but the root, in the surface's order.
  std::vector<TTestControl*> Controls;
  IPtr<IDesignSurfaceListener> Listener;
  IPtr<TRecordingPainter> Painter;
  IPtr<TRecordingGrabHandles> Handles;
  /// The boxes of the last drag.
  IPtr<TTestDragBoxes> Boxes;
  TPoint Origin, CursorPoint;
  /// Surface point (0, 0) lies at this global point.
  TPoint Scroll;
  bool GridDisabled = false;
  bool ShowGuides = true;
  /// `ValidateModification` raises `EComponentDesignerException` "Module is read-only".
  bool Refuse = false;
  /// Counts the items made, so a test can see that they are made fresh.
  int ItemsMade = 0;
};

} // namespace formkit::fakes
