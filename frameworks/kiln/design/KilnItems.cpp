//===- frameworks/kiln/design/KilnItems.cpp - Items of Kiln components --===//
#include "frameworks/kiln/design/KilnDesign.h"

namespace formkit {

FK_IMPLEMENT(TKilnControlItem, "KilnDesign") {}
FK_IMPLEMENT(TKilnIconItem, "KilnDesign") {}

namespace {

/// A component's guides as the surface asks for them: the same kinds, and the offsets
/// already in the container's coordinates.
class TKilnItemGuides : public TInterfacedObject, public IItemGuidelines {
  FK_CLASS(TKilnItemGuides, TInterfacedObject)
  FK_INTERFACES(IItemGuidelines)
  explicit TKilnItemGuides(IPtr<IComponentGuidelines> Guides) : FGuides(std::move(Guides)) {}
  int GetCount() override { return FGuides->GetCount(); }
  TGuideType GetDesignerGuideType(int Index) override { return FGuides->GetDesignerGuideType(Index); }
  int GetDesignerGuideOffset(int Index) override { return FGuides->GetDesignerGuideOffset(Index); }

private:
  IPtr<IComponentGuidelines> FGuides;
};

} // namespace

FK_IMPLEMENT(TKilnItemGuides, "KilnDesign") {}

//===----------------------------------------------------------------------===//
// Controls
//===----------------------------------------------------------------------===//

TKilnControlItem::TKilnControlItem(TControl* Control, TKilnSurface* Surface, const IPtr<IDesigner>& Designer)
    : TComponentItem(Control, Designer), FSurface(Surface) {}

bool TKilnControlItem::Contains(const IPtr<IItem>& Item) {
  auto* Other = dynamic_cast<TControl*>(ExtractComponent(Item));
  for (TControl* C = Other ? Other->Parent() : nullptr; C; C = C->Parent())
    if (C == Control()) return true;
  return false;
}

namespace {
/// Where a control's client area starts in the surface's coordinates.
TPoint OriginOf(TControl* Control, TWinControl* Container) {
  if (Control == Container) return {0, 0};
  return Control->ClientToParent({0, 0}, Container);
}
} // namespace

TPoint TKilnControlItem::GlobalToLocal(const TPoint& P) {
  TPoint O = OriginOf(Control(), FSurface->Container());
  return {P.X - O.X, P.Y - O.Y};
}

TPoint TKilnControlItem::LocalToGlobal(const TPoint& P) {
  TPoint O = OriginOf(Control(), FSurface->Container());
  return {P.X + O.X, P.Y + O.Y};
}

TRect TKilnControlItem::GetBoundsRect() {
  if (Control() == FSurface->Container()) return Control()->ClientRect();
  return Control()->BoundsRect();
}

TRect TKilnControlItem::GetClientRect() { return Control()->ClientRect(); }

IPtr<IItem> TKilnControlItem::GetParent() {
  if (Control() == FSurface->Container() || !Control()->Parent()) return nullptr;
  return FSurface->ItemOf(Control()->Parent());
}

bool TKilnControlItem::IsContainer() {
  return Control() == FSurface->Container() || Control()->ControlStyle().Contains(csAcceptsControls);
}

void TKilnControlItem::SetBoundsRect(const TRect& Rect) {
  if (Control() == FSurface->Container()) {
    Control()->SetClientWidth(Rect.Width());
    Control()->SetClientHeight(Rect.Height());
  } else {
    Control()->SetBoundsRect(Rect);
  }
}

IPtr<IItem> TKilnControlItem::GetChildren(int Index) {
  auto* Win = dynamic_cast<TWinControl*>(Control());
  if (!Win || Index < 0 || Index >= Win->ControlCount()) return nullptr;
  return FSurface->ItemOf(Win->Controls(Index));
}

int TKilnControlItem::GetChildCount() {
  auto* Win = dynamic_cast<TWinControl*>(Control());
  return Win ? Win->ControlCount() : 0;
}

void TKilnControlItem::SetParent(const IPtr<IItem>& Parent) {
  if (Control() == FSurface->Container()) return;
  auto* NewParent = dynamic_cast<TWinControl*>(ExtractComponent(Parent));
  if (!NewParent) return;
  if (NewParent != Control()->Parent()) Control()->SetParent(NewParent);
  FSurface->Root()->KeepOwnerWithParent(Control());
}

void TKilnControlItem::Show() {
  // On a design surface every control of the module shows, whatever its Visible says;
  // its parent chain must be in the window.
  if (!Control()->Parent() && Control() != FSurface->Container()) Control()->SetParent(FSurface->Container());
}

void TKilnControlItem::ZOrder(bool Front) {
  if (TWinControl* P = Control()->Parent()) {
    if (Front) P->BringToFront(Control());
    else P->SendToBack(Control());
  }
}

TRect TKilnControlItem::GetPaddedBoundsRect() {
  TRect R = GetBoundsRect();
  if (Control() == FSurface->Container()) return R;
  const TRect M = Control()->Margins();
  return TRect{R.Left - M.Left, R.Top - M.Top, R.Right + M.Right, R.Bottom + M.Bottom};
}

IPtr<IItemGuidelines> TKilnControlItem::GetItemGuidelines() {
  // The surface's coordinates are the container's client area.
  return NewAs<IItemGuidelines, TKilnItemGuides>(GuidelinesFor(FDesigner, Control(), FSurface->Container()));
}

//===----------------------------------------------------------------------===//
// Icons of non-visual components
//===----------------------------------------------------------------------===//

TKilnIconItem::TKilnIconItem(TComponent* Component, TKilnSurface* Surface, const IPtr<IDesigner>& Designer)
    : TComponentItem(Component, Designer), FSurface(Surface) {}

TRect TKilnIconItem::GetBoundsRect() {
  // The design position: left in the low 16 bits, top in the high 16, both signed.
  std::int32_t Info = GetComponent()->DesignInfo();
  int Left = static_cast<std::int16_t>(Info & 0xFFFF);
  int Top = static_cast<std::int16_t>((static_cast<std::uint32_t>(Info) >> 16) & 0xFFFF);
  return Bounds(Left, Top, KilnIconSize, KilnIconSize);
}

IPtr<IItem> TKilnIconItem::GetParent() { return FSurface->GetRoot(); }

void TKilnIconItem::SetBoundsRect(const TRect& Rect) {
  std::uint32_t Left = static_cast<std::uint16_t>(static_cast<std::int16_t>(Rect.Left));
  std::uint32_t Top = static_cast<std::uint16_t>(static_cast<std::int16_t>(Rect.Top));
  GetComponent()->SetDesignInfo(static_cast<std::int32_t>(Left | (Top << 16)));
}

} // namespace formkit
