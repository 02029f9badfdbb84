//===- frameworks/kiln/design/KilnGuidelines.cpp - Guides of Kiln controls ===//
//
// Edge guides stand on the control's outermost pixels. Margin and padding guides
// stand on boundaries between pixels, counted as the exclusive right and bottom
// of a rectangle are: a margin guide on the outer boundary of the margin, a
// padding guide on the inner boundary of the padding. Guides that face each
// other meet, so two neighbours stop with the sum of their margins between them,
// and a child stops with its margin plus its parent's padding between its edge
// and the parent's client edge, on the right and the bottom as on the left and
// the top.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/KilnDesign.h"

#include <iterator>

namespace formkit {

FK_IMPLEMENT(TControlGuidelines, "KilnDesign") {}
FK_IMPLEMENT(TWinControlGuidelines, "KilnDesign") {}
FK_IMPLEMENT(TCustomFormGuidelines, "KilnDesign") {}

namespace {
/// The padding a form without one shows its guides at.
constexpr TRect DefaultFormGuidePadding{5, 5, 5, 5};

constexpr TDesignerGuideType ControlGuideTypes[] = {gtAlignLeft,  gtAlignTop,  gtAlignRight,  gtAlignBottom,
                                                    gtMarginLeft, gtMarginTop, gtMarginRight, gtMarginBottom};
constexpr int ControlGuideCount = 8;
constexpr TDesignerGuideType PaddingGuideTypes[] = {gtPaddingLeft, gtPaddingTop, gtPaddingRight, gtPaddingBottom};

void CheckIndex(int Index, int Count) {
  if (Index < 0 || Index >= Count) throw EListError(SListIndexError, Index);
}
} // namespace

//===----------------------------------------------------------------------===//
// Controls
//===----------------------------------------------------------------------===//

void TControlGuidelines::RequireClass(TComponent* AComponent, TClass Class) const {
  if (!AComponent || !AComponent->InheritsFrom(Class))
    throw EInvalidCast(sKilnGuidelinesWrongClass, ClassName(), Class->ClassName,
                       AComponent ? AComponent->ClassName() : String("(none)"));
}

void TControlGuidelines::Initialize(TComponent* AComponent, TComponent* AContainer) {
  RequireClass(AComponent, TControl::StaticClass());
  inherited::Initialize(AComponent, AContainer);
  FClientDelta = AComponent == AContainer ? Control()->ClientOffset() : TPoint{};
}

TPoint TControlGuidelines::Origin() const {
  if (FComponent == FContainer) return {};
  const TControl* C = Control();
  const TPoint InParent{C->Left(), C->Top()};
  auto* Container = dynamic_cast<TWinControl*>(FContainer);
  if (C->Parent() && Container && C->Parent()->HasAncestor(Container))
    return C->Parent()->ClientToParent(InParent, Container);
  return InParent;
}

int TControlGuidelines::FromClientDelta(TDesignerGuideType Type, int Offset) const noexcept {
  return Offset - (IsHorzGuide(Type) ? FClientDelta.Y : FClientDelta.X);
}

TDesignerGuideType TControlGuidelines::GetDesignerGuideType(int Index) {
  CheckIndex(Index, ControlGuideCount);
  return ControlGuideTypes[Index];
}

int TControlGuidelines::GetGuideOffset(int Index) {
  CheckIndex(Index, ControlGuideCount);
  const TControl* C = Control();
  const TRect M = C->Margins();
  const int Offsets[] = {0, 0, C->Width() - 1, C->Height() - 1, -M.Left, -M.Top, C->Width() + M.Right,
                         C->Height() + M.Bottom};
  return FromClientDelta(ControlGuideTypes[Index], Offsets[Index]);
}

//===----------------------------------------------------------------------===//
// Windowed controls and forms
//===----------------------------------------------------------------------===//

void TWinControlGuidelines::Initialize(TComponent* AComponent, TComponent* AContainer) {
  RequireClass(AComponent, TWinControl::StaticClass());
  inherited::Initialize(AComponent, AContainer);
}

bool TWinControlGuidelines::HasPaddingGuides() const {
  return WinControl()->ControlStyle().Contains(csAcceptsControls) || WinControl()->InheritsFrom(TCustomFrame::StaticClass());
}

int TWinControlGuidelines::GetCount() {
  return HasPaddingGuides() ? ControlGuideCount + static_cast<int>(std::size(PaddingGuideTypes)) : ControlGuideCount;
}

TDesignerGuideType TWinControlGuidelines::GetDesignerGuideType(int Index) {
  if (Index >= 0 && Index < ControlGuideCount) return inherited::GetDesignerGuideType(Index);
  CheckIndex(Index, GetCount());
  return PaddingGuideTypes[Index - ControlGuideCount];
}

int TWinControlGuidelines::GetGuideOffset(int Index) {
  if (Index >= 0 && Index < ControlGuideCount) return inherited::GetGuideOffset(Index);
  CheckIndex(Index, GetCount());
  // The client area's edges, moved inwards by the padding.
  const TWinControl* W = WinControl();
  const TPoint Client = W->ClientOffset();
  const TRect P = GuidePadding();
  const int Offsets[] = {Client.X + P.Left, Client.Y + P.Top, Client.X + W->ClientWidth() - P.Right,
                         Client.Y + W->ClientHeight() - P.Bottom};
  const int At = Index - ControlGuideCount;
  return FromClientDelta(PaddingGuideTypes[At], Offsets[At]);
}

void TCustomFormGuidelines::Initialize(TComponent* AComponent, TComponent* AContainer) {
  RequireClass(AComponent, TCustomForm::StaticClass());
  inherited::Initialize(AComponent, AContainer);
}

TRect TCustomFormGuidelines::GuidePadding() const {
  const TRect P = inherited::GuidePadding();
  return P == TRect{} ? DefaultFormGuidePadding : P;
}

//===----------------------------------------------------------------------===//
// Guide lines on the surface
//===----------------------------------------------------------------------===//

void TKilnSurface::AddGuide(const TRect& Rect, TGuideType GuideType) {
  FGuideLines.push_back({Rect, GuideType});
  if (TCanvas* C = Canvas()) {
    C->MoveTo(Rect.Left, Rect.Top);
    C->LineTo(Rect.Right, Rect.Bottom);
  }
}

} // namespace formkit
