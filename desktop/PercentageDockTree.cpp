//===- desktop/PercentageDockTree.cpp - The dock tree of the environment -===//
#include "desktop/PercentageDockTree.h"

#include "desktop/IDEDockPanel.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnWindows.h"

#include <set>

namespace formkit {

TAlign DefaultInsertAt = alNone;
String ThemeCaptionFontName;
int ThemeCaptionFontSize = 0;
int ThemeCaptionPadding = 8;

namespace {
constexpr int DefaultGrabberSize = 24;
constexpr int MinColumnWidth = 230;

/// `MulDiv(Value, PPI of ASite, 96)`.
int ScaleFor(TWinControl* ASite, int Value) { return ASite ? ASite->ScaleValue(Value) : Value; }
} // namespace

TFont* GetCaptionDockedThemeFont(TWinControl*) {
  static TObjectGuard<TFont> Font(new TFont);
  bool Themed = !ThemeCaptionFontName.empty() && ThemeCaptionFontSize > 0;
  Font->SetName(Themed ? ThemeCaptionFontName : String("Segoe UI"));
  Font->SetSize(std::max(Themed ? ThemeCaptionFontSize : 9, 12));
  // The size is in points: the caller takes its pixel height at the site's resolution.
  return Font.Get();
}

//===----------------------------------------------------------------------===//
// TPercentageCaptionDrawer
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDockTreeInfo, "PercentageDockTree") {}
FK_IMPLEMENT(TPercentageCaptionDrawer, "PercentageDockTree") {}

int TPercentageCaptionDrawer::CalcButtonSize(const TRect& ACaption, TWinControl* ASite) const {
  if (Orientation() == dcoVertical) return ACaption.Width() - ScaleFor(ASite, 8);
  return ScaleFor(ASite, 20);
}

TRect TPercentageCaptionDrawer::GetCloseRect(const TRect& ACaption, TWinControl* ASite) const {
  int S = CalcButtonSize(ACaption, ASite);
  if (Orientation() == dcoVertical)
    return Bounds(ACaption.Left + (ACaption.Width() - S) / 2, ACaption.Top + ScaleFor(ASite, 8), S, S);
  return Bounds(ACaption.Right - ScaleFor(ASite, 4) - S, ACaption.Top + (ACaption.Height() - S) / 2 + 1, S, S);
}

TRect TPercentageCaptionDrawer::GetPinRect(const TRect& ACaption, TWinControl* ASite) const {
  int S = CalcButtonSize(ACaption, ASite);
  TRect Close = GetCloseRect(ACaption, ASite);
  if (Orientation() == dcoVertical) return Bounds(Close.Left, Close.Top + S * 2, S, S);
  return Bounds(ACaption.Right - ScaleFor(ASite, 4) - S * 2, Close.Top, S, S);
}

void TPercentageCaptionDrawer::DrawDockCaptionEx(TCanvas* ACanvas, TControl* AControl, const TRect& ACaption,
                                                 bool AFocused, const TDockTreeInfo& AInfo, TWinControl* ASite) const {
  ACanvas->Brush()->SetColor(AFocused ? clActiveCaption : clBtnFace);
  ACanvas->FillRect(ACaption);
  TRect Close = GetCloseRect(ACaption, ASite), Pin = GetPinRect(ACaption, ASite);
  for (auto [R, Hit] : {std::pair{Close, HTCLOSE}, std::pair{Pin, HTPIN}}) {
    ACanvas->Pen()->SetColor(AInfo.FHotButton == Hit ? clHighlight : clBtnShadow);
    ACanvas->FrameRect(R);
  }
  TRect Text = ACaption;
  if (Orientation() == dcoVertical)
    Text.Top = Pin.Bottom;
  else
    Text.Right = Pin.Left;
  ACanvas->TextRect(Text, Text.Left + 2, Text.Top + 1, AControl->Caption());
}

void TPercentageCaptionDrawer::DrawDockCaption(TCanvas* ACanvas, TControl* AControl, const TRect& ACaption,
                                               bool AFocused, TWinControl* ASite) const {
  TDockTreeInfo Info;
  DrawDockCaptionEx(ACanvas, AControl, ACaption, AFocused, Info, ASite);
}

//===----------------------------------------------------------------------===//
// TPercentageDockTree
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPercentageDockTree, "PercentageDockTree") {}

TPercentageDockTree::TPercentageDockTree(TWinControl* ADockSite, TDockCaptionOrientation AOrientation)
    : TCaptionedTabDockTree(ADockSite, AOrientation) {
  InitDrawer();
  SetBorderWidth(8);
}

std::unique_ptr<TDockCaptionDrawer> TPercentageDockTree::GetDockCaptionDrawer() const {
  return std::make_unique<TPercentageCaptionDrawer>(CaptionOrientation());
}

TDockTreeInfo* TPercentageDockTree::InfoOf(const TControl* Control) const {
  auto It = FControls.find(Control);
  return It == FControls.end() ? nullptr : It->second.Get();
}

int TPercentageDockTree::GetGrabberSize() const {
  auto* Panel = dynamic_cast<TEditorDockPanel*>(DockSite());
  if (Panel && !DockClients(Panel).empty() && Panel->HideDockTreeCaption()) return 0;
  TFont* Font = GetCaptionDockedThemeFont(DockSite());
  if (!Font) return DefaultGrabberSize;
  return Font->PixelHeight(DockSite() ? DockSite()->CurrentPPI() : DefaultPPI) + ThemeCaptionPadding;
}

TRect TPercentageDockTree::AdjustCaptionRect(const TRect& ARect) const {
  int G = GetGrabberSize();
  TRect R = ARect;
  if (G == 0) return R;
  if (CaptionOrientation() == dcoVertical) {
    R.Right = R.Left + G - 1;
    R.Left += 1;
    R.Bottom -= 3;
  } else {
    R.Left += 1;
    R.Bottom = R.Top + G - 1;
    R.Right -= 2;
  }
  return R;
}

bool TPercentageDockTree::MouseDown(TMouseButton Button, int X, int Y) {
  FLastMouseDownPos = Point(X, Y);
  return TCaptionedTabDockTree::MouseDown(Button, X, Y);
}

bool TPercentageDockTree::SplitterMoveAllowed(int X) const {
  TDockZone* Zone = SizingZone();
  auto* Panel = dynamic_cast<TEditorDockPanel*>(DockSite());
  if (!Zone || !Panel || !Zone->ParentZone() || Zone->ParentZone()->Orientation() != doVertical) return true;
  std::vector<TControl*> Clients = DockClients(Panel);
  TControl* C = Zone->ChildControl();
  if (!C) {
    if (Clients.empty() || (Panel->Align() != alLeft && Panel->Align() != alRight)) return true;
    C = Clients[0];
    for (TControl* K : Clients)
      if (Panel->Align() == alLeft ? K->Left() > C->Left() : K->Left() < C->Left()) C = K;
  }
  std::set<int> Lefts;
  for (TControl* K : Clients) Lefts.insert(K->Left());
  int N = static_cast<int>(Lefts.size());
  int D = X - FLastMouseDownPos.X;
  if (N <= 1 || D == 0) return true;
  bool Left = Panel->Align() == alLeft;
  int Rest = Left ? Panel->Width() - C->Width() + D : Panel->Width() - C->Width() - D;
  int New = Left ? C->Width() - D : C->Width() + D;
  int Min = Panel->ScaleValue(MinColumnWidth);
  return Min <= New && Rest >= (N - 1) * Min;
}

void TPercentageDockTree::MouseUp(TMouseButton Button, int X, int Y, bool& Handled) {
  bool Locked = Button == mbLeft && !TIDEDesktopService::IsDrawingLocked();
  if (Locked) TIDEDesktopService::LockDrawing();
  auto Unlock = Finally([Locked]() noexcept {
    if (Locked) RunIgnoringExceptions([] { TIDEDesktopService::UnLockDrawing(); });
  });
  if (!SplitterMoveAllowed(X)) {
    SetSizingZone(nullptr);
    auto* Panel = dynamic_cast<TEditorDockPanel*>(DockSite());
    Panel->DoSplitterMouseUp(Panel);
  }
  TCaptionedTabDockTree::MouseUp(Button, X, Y, Handled);
}

void TPercentageDockTree::Repaint() const {
  if (DockSite()) RedrawWindow(DockSite());
}

void TPercentageDockTree::MouseMove(int X, int Y) {
  TCaptionedTabDockTree::MouseMove(X, Y);
  auto* Drawer = dynamic_cast<TPercentageCaptionDrawer*>(DockCaptionDrawer());
  if (!Drawer) return;
  TPoint P = Point(X, Y);
  for (auto& [Control, Info] : FControls) {
    if (Info->FCaptionRect.Contains(P)) {
      int Hit = Drawer->DockCaptionHitTest(Info->FCaptionRect, P, DockSite());
      int Button = Hit == HTCLOSE || Hit == HTPIN ? Hit : 0;
      if (Button != Info->FHotButton) {
        Info->FHotButton = Button;
        Repaint();
      }
      return;
    }
    if (Info->FHotButton != 0) {
      Info->FHotButton = 0;
      Repaint();
    }
  }
}

void TPercentageDockTree::MouseLeave() {
  TCaptionedTabDockTree::MouseLeave();
  for (auto& [Control, Info] : FControls)
    if (Info->FHotButton != 0) {
      Info->FHotButton = 0;
      Repaint();
    }
}

void TPercentageDockTree::InsertControl(TControl* Control, TAlign InsertAt, TControl* DropControl) {
  if (!Control) return;
  if (!FControls.contains(Control)) FControls.emplace(Control, TObjectGuard<TDockTreeInfo>(new TDockTreeInfo));
  if (DefaultInsertAt != alNone && Control->Visible()) {
    InsertAt = DefaultInsertAt;
    DefaultInsertAt = alNone;
  }
  TCaptionedTabDockTree::InsertControl(Control, InsertAt, DropControl);
}

void TPercentageDockTree::RemoveControl(TControl* Control) {
  FControls.erase(Control);
  TCaptionedTabDockTree::RemoveControl(Control);
}

void TPercentageDockTree::PaintDockFrame(TCanvas* ACanvas, TControl* Control, const TRect& ARect) {
  TRect Caption = AdjustCaptionRect(ARect);
  TDockTreeInfo* Info = InfoOf(Control);
  if (Info) Info->FCaptionRect = Caption;
  auto* Drawer = dynamic_cast<TPercentageCaptionDrawer*>(DockCaptionDrawer());
  if (!Drawer || GetGrabberSize() == 0) return;
  auto* Form = GetParentForm(Control);
  bool Focused = Form && GetFocus() && GetFocus()->HasAncestor(Control);
  if (Info)
    Drawer->DrawDockCaptionEx(ACanvas, Control, Caption, Focused, *Info, DockSite());
  else
    Drawer->DrawDockCaption(ACanvas, Control, Caption, Focused, DockSite());
}

} // namespace formkit
