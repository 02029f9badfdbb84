//===- frameworks/kiln/design/KilnSurface.cpp - The surface of a Kiln module ===//
#include "frameworks/kiln/design/KilnDesign.h"

namespace formkit {

FK_IMPLEMENT(TKilnSurface, "KilnDesign") {}
FK_IMPLEMENT(TKilnGrabHandles, "KilnDesign") {}
FK_IMPLEMENT(TKilnDragBoxes, "KilnDesign") {}

namespace {

/// An item's bounds in the surface's coordinates.
TRect SurfaceBounds(const IPtr<IItem>& Item) {
  TRect B = Item->GetBoundsRect();
  if (IPtr<IItem> Parent = Item->GetParent()) {
    TPoint O = Parent->LocalToGlobal({0, 0});
    B.Offset(O.X, O.Y);
  }
  return B;
}
} // namespace

//===----------------------------------------------------------------------===//
// Drag boxes and grab handles
//===----------------------------------------------------------------------===//

void TKilnDragBoxes::DrawBox(const TRect& Rect, TDesignBoxStyle) {
  if (FCanvas) FCanvas->FrameRect(Rect);
}

void TKilnGrabHandles::AttachHandles(const IPtr<IItem>& Item) {
  FItem = Item;
  RefreshHandles();
}

namespace {
struct THandle {
  TPoint Center;
  TMoveAffects Affects;
};
std::vector<THandle> HandlesAround(const TRect& B) {
  int MX = B.Left + B.Width() / 2, MY = B.Top + B.Height() / 2;
  return {{{B.Left, B.Top}, {gaLeft, gaTop}},     {{MX, B.Top}, {gaTop}},
          {{B.Right, B.Top}, {gaRight, gaTop}},   {{B.Right, MY}, {gaRight}},
          {{B.Right, B.Bottom}, {gaRight, gaBottom}}, {{MX, B.Bottom}, {gaBottom}},
          {{B.Left, B.Bottom}, {gaLeft, gaBottom}}, {{B.Left, MY}, {gaLeft}}};
}
TRect HandleRect(TPoint C) {
  return Bounds(C.X - KilnHandleSize / 2, C.Y - KilnHandleSize / 2, KilnHandleSize, KilnHandleSize);
}
} // namespace

void TKilnGrabHandles::SetHandlesActive(bool Value) {
  FActive = Value;
  RefreshHandles();
}

TMoveAffects TKilnGrabHandles::HandleAtPoint(int X, int Y) {
  if (!FItem || !FActive) return {};
  for (const THandle& H : HandlesAround(SurfaceBounds(FItem)))
    if (HandleRect(H.Center).Contains({X, Y})) return H.Affects;
  return {};
}

void TKilnGrabHandles::RefreshHandles() {
  if (!FItem || !FSurface) return;
  // Active handles are filled; inactive ones only framed.
  for (const THandle& H : HandlesAround(SurfaceBounds(FItem))) {
    if (FActive) FSurface->Canvas()->FillRect(HandleRect(H.Center));
    else FSurface->Canvas()->FrameRect(HandleRect(H.Center));
  }
}

//===----------------------------------------------------------------------===//
// The surface
//===----------------------------------------------------------------------===//

TKilnSurface::TKilnSurface(TKilnRoot* Root, TWinControl* Container)
    : FKilnRoot(Root), FContainer(Container), FHandles(New<TKilnGrabHandles>(this)), FCanvas(new TCanvas) {
  FGrabHandles = FHandles;
}

void TKilnSurface::BeforeDestruction() {
  FHandles = nullptr;
  FCanvas.Reset();
  inherited::BeforeDestruction();
}

void* TKilnSurface::GetInterfaceEntry(const TGUID& IID) {
  if (void* P = detail::FindInterface<TKilnSurface, IGuidelinePainter>(this, IID)) return P;
  return inherited::GetInterfaceEntry(IID);
}

IPtr<IItem> TKilnSurface::ItemOf(TComponent* Component) {
  if (!Component || !FKilnRoot) return nullptr;
  IPtr<IDesigner> Designer = FKilnRoot->AsDesigner();
  if (auto* Control = dynamic_cast<TControl*>(Component))
    return NewAs<IItem, TKilnControlItem>(Control, this, Designer);
  if (Component->Owner() == FKilnRoot->Root()) return NewAs<IItem, TKilnIconItem>(Component, this, Designer);
  return NewAs<IItem, TNonControlItem>(Component, Designer);
}

TPoint TKilnSurface::InputPoint(int X, int Y) const {
  TPoint Offset = ScrollOffset();
  return {X + Offset.X, Y + Offset.Y};
}

TPoint TKilnSurface::ScrollOffset() const {
  auto* Area = dynamic_cast<TScrollingWinControl*>(FContainer);
  if (!Area || dynamic_cast<TCustomForm*>(FContainer)) return {0, 0};
  return {Area->HorzScrollBar()->Position(), Area->VertScrollBar()->Position()};
}

IPtr<IItem> TKilnSurface::GetRoot() { return ItemOf(FContainer); }

IPtr<IItem> TKilnSurface::ItemAtPoint(int X, int Y) {
  TComponent* Root = FKilnRoot ? FKilnRoot->Root() : nullptr;
  // Icons lie above the controls; the last one above the others.
  if (Root)
    for (int I = Root->ComponentCount() - 1; I >= 0; --I) {
      TComponent* C = Root->Components(I);
      if (dynamic_cast<TControl*>(C)) continue;
      IPtr<IItem> Icon = ItemOf(C);
      if (Icon->GetBoundsRect().Contains({X, Y})) return Icon;
    }
  // Then the deepest control of the module under the point.
  TWinControl* Current = FContainer;
  TPoint P{X, Y};
  for (;;) {
    TControl* Hit = Current->ControlAtPos(P, true, true, false);
    if (!Hit || (Root && Hit->Owner() != Root && Hit != Root)) break;
    TPoint O = Hit->ClientToParent({0, 0}, Current);
    P = {P.X - O.X, P.Y - O.Y};
    auto* Win = dynamic_cast<TWinControl*>(Hit);
    if (!Win) return ItemOf(Hit);
    Current = Win;
  }
  return ItemOf(Current);
}

IPtr<IDragBoxes> TKilnSurface::BeginDrag(const IPtr<IItem>&, const TPoint&) {
  return NewAs<IDragBoxes, TKilnDragBoxes>(FCanvas.Get(), GetGuidelinePainter());
}

IPtr<IItem> TKilnSurface::FindNextItem(const IPtr<IItem>& Item, bool Forward) {
  int Count = GetItemsCount();
  if (Count == 0) return nullptr;
  int At = -1;
  for (int I = 0; I < Count && At < 0; ++I)
    if (SameItem(GetItems(I), Item)) At = I;
  int Next = At < 0 ? (Forward ? 0 : Count - 1) : (At + (Forward ? 1 : Count - 1)) % Count;
  return GetItems(Next);
}

void TKilnSurface::Close() {
  if (FHandles) FHandles->AttachHandles(nullptr);
  inherited::Close();
  FListener = nullptr;
  FKilnRoot = nullptr;
}

void TKilnSurface::SetOptions(const TDesignSurfaceOptions& Options) {
  inherited::SetOptions(Options);
  FOptions = Options;
}

void TKilnSurface::UpdateSurface() {
  // Icons of the non-visual components, with their names.
  TComponent* Root = FKilnRoot ? FKilnRoot->Root() : nullptr;
  if (!Root || !FOptions.ShowNonVisualComponents) return;
  for (int I = 0; I < Root->ComponentCount(); ++I) {
    TComponent* C = Root->Components(I);
    if (dynamic_cast<TControl*>(C)) continue;
    TRect B = ItemOf(C)->GetBoundsRect();
    FCanvas->Rectangle(B);
    if (FOptions.ShowComponentCaptions) FCanvas->TextOut(B.Left, B.Bottom, C->Name());
  }
}

void TKilnSurface::ItemRemoved(TComponent* Component) {
  if (FHandles && ExtractComponent(FHandles->GetAttachedItem()) == Component) FHandles->AttachHandles(nullptr);
}

//===----------------------------------------------------------------------===//
// Input
//===----------------------------------------------------------------------===//

void TKilnSurface::MouseDown(int X, int Y, TShiftState Shift, bool DoubleClick) {
  FCursor = InputPoint(X, Y);
  if (!FListener) return;
  TMoveAffects Affects = FHandles->HandleAtPoint(FCursor.X, FCursor.Y);
  IPtr<IItem> Item = Affects.Empty() ? ItemAtPoint(FCursor.X, FCursor.Y) : FHandles->GetAttachedItem();
  FListener->MouseDown(Item, Shift, FCursor.X, FCursor.Y, DoubleClick, Affects, false);
}

void TKilnSurface::MouseMove(int X, int Y) {
  FCursor = InputPoint(X, Y);
  if (FListener) FListener->MouseMove(FCursor.X, FCursor.Y);
}

void TKilnSurface::MouseUp(int X, int Y) {
  FCursor = InputPoint(X, Y);
  if (FListener) FListener->MouseUp(FCursor.X, FCursor.Y);
}

void TKilnSurface::KeyDown(TDesignKeyCode Key, TShiftState Shift, char Ch) {
  if (FListener) FListener->Key(Key, Shift, Ch, false);
}

} // namespace formkit
