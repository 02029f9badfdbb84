//===- frameworks/kiln/KilnComCtrls.cpp - Status bars and their panels ---===//
#include "frameworks/kiln/KilnComCtrls.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SInvalidPanelWidth, "Panel width %d is not valid: it must be 0 or more");

//===----------------------------------------------------------------------===//
// TStatusPanel
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStatusPanel, "KilnComCtrls") {
  B.Property("Text", &TStatusPanel::Text, &TStatusPanel::SetText);
  B.Property("Width", &TStatusPanel::Width, &TStatusPanel::SetWidth).Default(50);
}

void TStatusPanel::SetText(const String& Value) {
  if (FText == Value) return;
  FText = Value;
  Changed(false);
}

void TStatusPanel::SetWidth(int Value) {
  if (Value < 0) throw EInvalidOperation(SInvalidPanelWidth, Value);
  if (FWidth == Value) return;
  FWidth = Value;
  Changed(false);
}

String TStatusPanel::GetDisplayName() { return FText.empty() ? inherited::GetDisplayName() : FText; }

void TStatusPanel::Assign(TPersistent* Source) {
  auto* Other = dynamic_cast<TStatusPanel*>(Source);
  if (!Other) return inherited::Assign(Source);
  FText = Other->FText;
  FWidth = Other->FWidth;
  Changed(false);
}

//===----------------------------------------------------------------------===//
// TStatusPanels
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStatusPanels, "KilnComCtrls") {}

TStatusPanels::TStatusPanels(TStatusBar* Bar) : TOwnedCollection(Bar, TStatusPanel::StaticClass()) {}

//===----------------------------------------------------------------------===//
// TStatusBar
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStatusBar, "KilnComCtrls") {
  B.Property("Align", &TControl::Align, &TControl::SetAlign).Default(alBottom);
  detail::PublishColor(B, clBtnFace);
  detail::PublishFont(B);
  B.Property("Panels", &TStatusBar::Panels, &TStatusBar::SetPanels);
  B.Property("SimplePanel", &TStatusBar::SimplePanel, &TStatusBar::SetSimplePanel).Default(false);
  B.Property("SimpleText", &TStatusBar::SimpleText, &TStatusBar::SetSimpleText);
  detail::PublishVisible(B);
  detail::PublishOnClick(B);
}

void TStatusBar::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FPanels = new TStatusPanels(this);
  SetControlStyle({csCaptureMouse, csClickEvents, csDoubleClicks, csOpaque});
  SetColor(clBtnFace);
  SetBounds(0, 0, 150, 19);
  SetAlign(alBottom);
}

void TStatusBar::BeforeDestruction() {
  FreeAndNil(FPanels);
  inherited::BeforeDestruction();
}

void TStatusBar::SetPanels(TStatusPanels* Value) { FPanels->Assign(Value); }

void TStatusBar::Paint(TCanvas* Canvas) {
  TRect R = ClientRect();
  Canvas->Brush()->SetColor(Color());
  Canvas->FillRect(R);
  Canvas->Font()->Assign(Font());
  if (FSimplePanel) {
    Canvas->TextRect(R, R.Left + 2, R.Top + 2, FSimpleText);
    return;
  }
  int Left = R.Left;
  for (int I = 0; I < FPanels->Count(); ++I) {
    TStatusPanel* Panel = FPanels->Items(I);
    bool Last = I == FPanels->Count() - 1;
    TRect Cell = Rect(Left, R.Top, Last ? std::max(R.Right, Left) : Left + Panel->Width(), R.Bottom);
    Canvas->TextRect(Cell, Cell.Left + 2, Cell.Top + 2, Panel->Text());
    if (!Last) {
      Canvas->MoveTo(Cell.Right, R.Top);
      Canvas->LineTo(Cell.Right, R.Bottom);
    }
    Left = Cell.Right + 1;
  }
}

} // namespace formkit
