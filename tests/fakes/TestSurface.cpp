//===- tests/fakes/TestSurface.cpp - The headless design surface ---------===//
#include "tests/fakes/TestSurface.h"

namespace formkit::fakes {

FK_IMPLEMENT(TTestControl, "TestSurface") {}
FK_IMPLEMENT(TTestGuidelines, "TestSurface") {}
FK_IMPLEMENT(TTestItem, "TestSurface") {}
FK_IMPLEMENT(TRecordingPainter, "TestSurface") {}
FK_IMPLEMENT(TRecordingGrabHandles, "TestSurface") {}
FK_IMPLEMENT(TTestDragBoxes, "TestSurface") {}
FK_IMPLEMENT(TTestSurface, "TestSurface") {}
FK_IMPLEMENT(TTestTools, "TestSurface") {}

namespace {
String RectText(const TRect& R) {
  return std::to_string(R.Left) + "," + std::to_string(R.Top) + "," + std::to_string(R.Right) + "," +
         std::to_string(R.Bottom);
}
} // namespace

TRect TTestControl::ClientRect() const {
  return TRect{0, 0, Bounds.Width() - 2 * ClientOffset.X, Bounds.Height() - 2 * ClientOffset.Y};
}

//===----------------------------------------------------------------------===//
// Items
//===----------------------------------------------------------------------===//

void* TTestItem::GetInterfaceEntry(const TGUID& IID) {
  TTestControl* C = Control();
  if (IID == IItem2D::IID) return C && C->Whole && C->Extended ? static_cast<IItem2D*>(this) : nullptr;
  if (IID == IItemEx::IID) return C && C->Extended ? static_cast<IItemEx*>(this) : nullptr;
  if (IID == IComponentItem::IID) return static_cast<IComponentItem*>(this);
  return inherited::GetInterfaceEntry(IID);
}

bool TTestItem::Contains(const IPtr<IItem>& Item) {
  for (TTestControl* C = FSurface->ControlOf(Item); C; C = C->Parent)
    if (C->Parent == Control()) return true;
  return false;
}

void TTestItem::Delete() {
  std::erase(FSurface->Controls, Control());
  FSurface->Log.Add("Delete(" + Control()->Name() + ")");
  inherited::Delete();
}

TPoint TTestItem::GlobalToLocal(const TPoint& P) {
  TPoint O = FSurface->ClientOrigin(Control());
  return {P.X - O.X, P.Y - O.Y};
}

TPoint TTestItem::LocalToGlobal(const TPoint& P) {
  TPoint O = FSurface->ClientOrigin(Control());
  return {P.X + O.X, P.Y + O.Y};
}

IPtr<IItem> TTestItem::GetParent() {
  return Control()->Parent ? FSurface->ItemOf(Control()->Parent) : nullptr;
}

void TTestItem::SetBoundsRect(const TRect& Rect) {
  FSurface->Log.Add("SetBounds(" + Control()->Name() + "," + RectText(Rect) + ")");
  Control()->Bounds = Rect;
}

void TTestItem::Edit() {
  ++Control()->Edits;
  FSurface->Log.Add("Edit(" + Control()->Name() + ")");
}

TRect TTestItem::GetPaddedBoundsRect() {
  const TTestControl* C = Control();
  return TRect{C->Bounds.Left - C->Margins.Left, C->Bounds.Top - C->Margins.Top,
               C->Bounds.Right + C->Margins.Right, C->Bounds.Bottom + C->Margins.Bottom};
}

IPtr<IItemGuidelines> TTestItem::GetItemGuidelines() {
  const TTestControl* C = Control();
  IPtr<TTestGuidelines> G = New<TTestGuidelines>();
  auto& L = G->Guides;
  const TPoint RootOrigin = FSurface->ClientOrigin(FSurface->Root);
  TRect Client = C->ClientRect();
  TRect Pad = C->Padding;
  int X, Y; // the control's origin in the container's coordinates
  if (C == FSurface->Root) {
    // The container's own guides are in its client coordinates.
    X = -C->ClientOffset.X;
    Y = -C->ClientOffset.Y;
    if (Pad == TRect{}) Pad = TRect{5, 5, 5, 5};
  } else {
    TPoint O = FSurface->ClientOrigin(C->Parent);
    X = O.X - RootOrigin.X + C->Bounds.Left;
    Y = O.Y - RootOrigin.Y + C->Bounds.Top;
  }
  const int W = C->Bounds.Width(), H = C->Bounds.Height();
  L = {{gtAlignLeft, X},
       {gtAlignTop, Y},
       {gtAlignRight, X + W - 1},
       {gtAlignBottom, Y + H - 1},
       {gtMarginLeft, X - C->Margins.Left},
       {gtMarginTop, Y - C->Margins.Top},
       {gtMarginRight, X + W + C->Margins.Right},
       {gtMarginBottom, Y + H + C->Margins.Bottom}};
  if (C->Container || C == FSurface->Root) {
    const int CX = X + C->ClientOffset.X, CY = Y + C->ClientOffset.Y;
    L.push_back({gtPaddingLeft, CX + Pad.Left});
    L.push_back({gtPaddingTop, CY + Pad.Top});
    L.push_back({gtPaddingRight, CX + Client.Right - Pad.Right});
    L.push_back({gtPaddingBottom, CY + Client.Bottom - Pad.Bottom});
  }
  if (C->Baseline >= 0) L.push_back({gtBaseline, Y + C->Baseline});
  return IPtr<IItemGuidelines>(G);
}

//===----------------------------------------------------------------------===//
// Handles, painter and boxes
//===----------------------------------------------------------------------===//

void TRecordingGrabHandles::AttachHandles(const IPtr<IItem>& Item) {
  Attached = Item;
  if (FLog) FLog->Add("AttachHandles(" + TTestSurface::NameOf(Item) + ")");
}

void TTestDragBoxes::DrawBox(const TRect& Rect, TDesignBoxStyle Style) {
  Draws.push_back("Draw(" + RectText(Rect) + "," + (Style == dbsItem ? "item" : "band") + ")");
  int& P = FParity[{Rect.Left, Rect.Top, Rect.Right, Rect.Bottom, Style}];
  P ^= 1;
}

void TTestDragBoxes::DrawBox(const TRect& Rect, const IPtr<IDragImage>& Image, TDesignBoxStyle Style) {
  DrawBox(Rect, Style);
  if (Image) Draws.back() += "Image";
}

std::vector<TRect> TTestDragBoxes::Visible() const {
  std::vector<TRect> R;
  for (const auto& [Key, Parity] : FParity)
    if (Parity) R.push_back(TRect{std::get<0>(Key), std::get<1>(Key), std::get<2>(Key), std::get<3>(Key)});
  return R;
}

void TTestDragBoxes::AddGuide(const TRect& Rect, TGuideType GuideType) {
  if (FSurface && FSurface->Painter) FSurface->Painter->AddGuide(Rect, GuideType);
}
void TTestDragBoxes::BeginPaint() {
  if (FSurface && FSurface->Painter) FSurface->Painter->BeginPaint();
}
void TTestDragBoxes::ClearGuides() {
  if (FSurface && FSurface->Painter) FSurface->Painter->ClearGuides();
}
void TTestDragBoxes::EndPaint() {
  if (FSurface && FSurface->Painter) FSurface->Painter->EndPaint();
}

//===----------------------------------------------------------------------===//
// Surface
//===----------------------------------------------------------------------===//

TTestSurface::TTestSurface() {
  Root = CreateComponentOf<TTestControl>(nullptr);
  Root->ChangeName("Form1");
  Root->Bounds = TRect{0, 0, 640, 480};
  Root->Container = true;
  Painter = New<TRecordingPainter>();
  Handles = New<TRecordingGrabHandles>(&Log);
}

void TTestSurface::BeforeDestruction() {
  Listener = nullptr;
  Boxes = nullptr;
  Controls.clear();
  FreeAndNil(Root);
  inherited::BeforeDestruction();
}

TTestControl* TTestSurface::AddControl(TTestControl* Parent, const String& Name, const TRect& Bounds,
                                       bool Container) {
  TTestControl* C = CreateComponentOf<TTestControl>(Root);
  C->ChangeName(Name);
  C->Parent = Parent ? Parent : Root;
  C->Bounds = Bounds;
  C->Container = Container;
  Controls.push_back(C);
  return C;
}

IPtr<IItem> TTestSurface::ItemOf(TTestControl* Control) {
  if (!Control) return nullptr;
  ++ItemsMade;
  return IPtr<IItem>(static_cast<IItem*>(static_cast<IItemEx*>(New<TTestItem>(this, Control).Get())));
}

TPoint TTestSurface::ClientOrigin(const TTestControl* C) const {
  if (!C || C == Root || !C->Parent) return Root->ClientOffset;
  TPoint O = ClientOrigin(C->Parent);
  return {O.X + C->Bounds.Left + C->ClientOffset.X, O.Y + C->Bounds.Top + C->ClientOffset.Y};
}

TTestControl* TTestSurface::ControlOf(const IPtr<IItem>& Item) const {
  return dynamic_cast<TTestControl*>(ExtractComponent(Item));
}

String TTestSurface::NameOf(const IPtr<IItem>& Item) {
  TComponent* C = ExtractComponent(Item);
  return C ? C->Name() : String("nil");
}

IPtr<IDragBoxes> TTestSurface::BeginDrag(const IPtr<IItem>& Parent, const TPoint& Point) {
  Log.Add("BeginDrag(" + NameOf(Parent) + "," + std::to_string(Point.X) + "," + std::to_string(Point.Y) + ")");
  Boxes = New<TTestDragBoxes>(this);
  return IPtr<IDragBoxes>(Boxes);
}

IPtr<IItem> TTestSurface::CreateItem(const IPtr<IItem>& Parent, const TRect& Rect, bool Scaled) {
  Log.Add("CreateItem(" + NameOf(Parent) + "," + RectText(Rect) + "," + (Scaled ? "scaled" : "sized") + ")");
  TTestControl* P = ControlOf(Parent);
  return ItemOf(AddControl(P, "Control" + std::to_string(Controls.size() + 1), Rect));
}

IPtr<IItem> TTestSurface::FindNextItem(const IPtr<IItem>& Item, bool Forward) {
  TTestControl* Current = ControlOf(Item);
  TTestControl* Parent = Current ? Current->Parent : Root;
  std::vector<TTestControl*> Siblings;
  for (TTestControl* C : Controls)
    if (C->Parent == Parent) Siblings.push_back(C);
  if (Siblings.empty()) return nullptr;
  int Index = -1;
  for (size_t I = 0; I < Siblings.size(); ++I)
    if (Siblings[I] == Current) Index = static_cast<int>(I);
  const int N = static_cast<int>(Siblings.size());
  int Next = Index < 0 ? (Forward ? 0 : N - 1) : (Index + (Forward ? 1 : N - 1)) % N;
  return ItemOf(Siblings[Next]);
}

IPtr<IItem> TTestSurface::ItemAtPoint(int X, int Y) {
  const TPoint G = DesignToGlobal({X, Y});
  TTestControl* Hit = Root;
  // Later controls lie above earlier ones; the deepest hit wins.
  for (bool Found = true; Found;) {
    Found = false;
    for (auto It = Controls.rbegin(); It != Controls.rend(); ++It) {
      TTestControl* C = *It;
      if (C->Parent != Hit) continue;
      const TPoint O = ClientOrigin(Hit);
      TRect B = C->Bounds;
      B.Offset(O.X, O.Y);
      if (B.Contains(G)) {
        Hit = C;
        Found = true;
        break;
      }
    }
  }
  return ItemOf(Hit);
}

void TTestSurface::ValidateModification() {
  Log.Add("ValidateModification");
  if (Refuse) throw EComponentDesignerException("Module is read-only");
}

bool TTestSurface::ItemInSelections(const IPtr<ISelections>& Selections, const IPtr<IItem>& Item) {
  const IPtr<IItem> Container = GetContainerItem();
  for (IPtr<IItem> Current = Item; Current;) {
    if (Selections->Selected(Current)) return true;
    Current = Current->GetParent();
    if (SameItem(Current, Container)) break;
  }
  return false;
}

IPtr<IItem> TTestSurface::ItemFromComponent(TComponent* Component) {
  return ItemOf(dynamic_cast<TTestControl*>(Component));
}

} // namespace formkit::fakes
