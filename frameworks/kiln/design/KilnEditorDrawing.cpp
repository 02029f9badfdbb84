//===- frameworks/kiln/design/KilnEditorDrawing.cpp - Owner drawing and check boxes ===//
#include "frameworks/kiln/design/KilnEditors.h"

namespace formkit {

bool FontNamePropertyDisplayFontNames = false;
int PropertyDrawingOffset = 8;
String BaseRegistryKey;

FK_IMPLEMENT(TSelectionMessageList, "KilnEditors") {}
FK_IMPLEMENT(TBooleanProperty, "KilnEditors") {}
FK_IMPLEMENT(KilnEditors::TSetElementProperty, "KilnEditors") {}
FK_IMPLEMENT(KilnEditors::TSetProperty, "KilnEditors") {}

//===----------------------------------------------------------------------===//
// Canvas state and text lines
//===----------------------------------------------------------------------===//

namespace detail {

TSavedCanvasState::TSavedCanvasState(TCanvas* Canvas)
    : FCanvas(Canvas), FFont(new TFont), FPen(new TPen), FBrush(new TBrush) {
  FFont->Assign(Canvas->Font());
  FPen->Assign(Canvas->Pen());
  FBrush->Assign(Canvas->Brush());
}

TSavedCanvasState::~TSavedCanvasState() {
  FCanvas->Font()->Assign(FFont.Get());
  FCanvas->Pen()->Assign(FPen.Get());
  FCanvas->Brush()->Assign(FBrush.Get());
}

void DrawTextLine(TCanvas* Canvas, const TRect& R, int Left, const String& Text) {
  int Top = R.Top + (R.Height() - Canvas->TextHeight(Text)) / 2;
  Canvas->TextRect(Rect(Left, R.Top, R.Right, R.Bottom), Left, Top, Text);
}

} // namespace detail

//===----------------------------------------------------------------------===//
// Default drawing
//===----------------------------------------------------------------------===//

String GetDisplayValue(const IPtr<IProperty>& Prop) {
  return Prop && Prop->AllEqual() ? Prop->GetValue() : String();
}

void DefaultPropertyDrawName(TPropertyEditor* Prop, TCanvas* Canvas, const TRect& Rect, int Offset) {
  detail::DrawTextLine(Canvas, Rect, Rect.Left + Offset + 2, Prop->GetName());
}

void DefaultPropertyDrawValue(TPropertyEditor* Prop, TCanvas* Canvas, const TRect& Rect, int Offset) {
  detail::DrawTextLine(Canvas, Rect, Rect.Left + Offset + 1, Prop->GetVisualValue());
}

void DefaultPropertyListDrawValue(const String& Value, TCanvas* Canvas, const TRect& Rect, bool, int Offset) {
  Canvas->FillRect(Rect);
  detail::DrawTextLine(Canvas, Rect, Rect.Left + Offset + 1, Value);
}

void DefaultPropertyListDrawValue(const WideString& Value, TCanvas* Canvas, const TRect& Rect, bool, int Offset) {
  Canvas->FillRect(Rect);
  Canvas->TextRect(Rect, Rect.Left + Offset + 1, Rect.Top + 1, Utf16ToUtf8(Value));
}

//===----------------------------------------------------------------------===//
// Check boxes
//===----------------------------------------------------------------------===//

void DrawCheckbox(TCanvas* ACanvas, const TRect& ARect, bool, bool AEnabled, bool AAllEqual, bool AValue) {
  // No theme here: the plain check box, a framed square with a tick, or filled when the
  // objects disagree.
  detail::TSavedCanvasState Saved(ACanvas);
  const TColor Ink = AEnabled ? clWindowText : clGrayText;
  ACanvas->Brush()->SetStyle(bsSolid);
  ACanvas->Brush()->SetColor(AEnabled ? clWindow : clBtnFace);
  ACanvas->FillRect(ARect);
  ACanvas->Brush()->SetColor(Ink);
  ACanvas->FrameRect(ARect);
  TRect Inner = Rect(ARect.Left + 3, ARect.Top + 3, ARect.Right - 3, ARect.Bottom - 3);
  if (!AAllEqual) {
    ACanvas->Brush()->SetColor(clGrayText);
    ACanvas->FillRect(Inner);
  } else if (AValue) {
    ACanvas->Pen()->SetColor(Ink);
    ACanvas->Pen()->SetStyle(psSolid);
    int MidY = (Inner.Top + Inner.Bottom) / 2;
    int ElbowX = Inner.Left + Inner.Width() / 3;
    ACanvas->MoveTo(Inner.Left, MidY);
    ACanvas->LineTo(ElbowX, Inner.Bottom - 1);
    ACanvas->LineTo(Inner.Right, Inner.Top);
  }
}

namespace {

TRect SquareAtLeft(const TRect& R) { return Rect(R.Left, R.Top, R.Left + R.Bottom - R.Top, R.Bottom); }

/// True when (X, Y) lies in `R`, whose right and bottom are outside.
bool Inside(const TRect& R, int X, int Y) { return X >= R.Left && X < R.Right && Y >= R.Top && Y < R.Bottom; }

} // namespace

TRect TBooleanProperty::CBRect(const TRect& ItemRect) {
  return Rect(ItemRect.Right + 4, ItemRect.Top, ItemRect.Right + ItemRect.Height(), ItemRect.Bottom);
}

void TBooleanProperty::PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawName(this, ACanvas, ARect);
}

void TBooleanProperty::PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  DrawCheckbox(ACanvas, ARect, ASelected, !GetAttributes().Contains(paReadOnly), AllEqual(), GetOrdValue() != 0);
}

TRect TBooleanProperty::PropDrawValueRect(const TRect& ARect) { return SquareAtLeft(ARect); }

void TBooleanProperty::MouseUp(TMouseButton, TShiftState, int X, int Y, bool InNameRect, const TRect& ItemRect,
                               bool& Handled) {
  Handled = false;
  if (GetAttributes().Contains(paReadOnly) || InNameRect || !Inside(CBRect(ItemRect), X, Y)) return;
  SetOrdValue(1 - GetOrdValue());
  Handled = true;
}

//===----------------------------------------------------------------------===//
// Sets
//===----------------------------------------------------------------------===//

namespace {
const TTypeData* ElementData(PTypeInfo SetType) { return GetTypeData(GetTypeData(SetType)->CompType()); }
} // namespace

namespace KilnEditors {

IPtr<IProperty> TSetElementProperty::CreateFor(TPropertyEditor& Parent, int Element) {
  IPtr<TSetElementProperty> Result = New<TSetElementProperty>();
  Result->CreateNested(Parent);
  Result->FElement = Element;
  Result->FBit = Element - static_cast<int>(ElementData(Parent.GetPropType())->MinValue);
  return Result;
}

TRect TSetElementProperty::CBRect(const TRect& ItemRect) {
  return Rect(ItemRect.Right + 2, ItemRect.Top, ItemRect.Right + ItemRect.Height() + 2, ItemRect.Bottom);
}

void TSetElementProperty::PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawName(this, ACanvas, ARect);
}

void TSetElementProperty::PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  bool Checked = FBit < 32 && ((static_cast<std::uint32_t>(GetOrdValue()) >> FBit) & 1u);
  DrawCheckbox(ACanvas, ARect, ASelected, !GetAttributes().Contains(paReadOnly), AllEqual(), Checked);
}

TRect TSetElementProperty::PropDrawValueRect(const TRect& ARect) { return SquareAtLeft(ARect); }

void TSetElementProperty::MouseUp(TMouseButton, TShiftState, int X, int Y, bool, const TRect& ItemRect,
                                  bool& Handled) {
  Handled = false;
  // A bit beyond the 32 of the value cannot be shown, so it is never changed.
  if (FBit >= 32 || GetAttributes().Contains(paReadOnly) || !Inside(CBRect(ItemRect), X, Y)) return;
  SetOrdValue(static_cast<std::int32_t>(static_cast<std::uint32_t>(GetOrdValue()) ^ (std::uint32_t(1) << FBit)));
  Handled = true;
}

void TSetProperty::GetProperties(const TGetPropProc& Proc) {
  const TTypeData* Element = ElementData(GetPropType());
  for (std::int64_t E = Element->MinValue; E <= Element->MaxValue; ++E)
    Proc(TSetElementProperty::CreateFor(*this, static_cast<int>(E)));
}

} // namespace KilnEditors

//===----------------------------------------------------------------------===//
// Selection messages
//===----------------------------------------------------------------------===//

TSelectionMessageList::TSelectionMessageList() : FList(NewAs<IInterfaceList, TInterfaceList>()) {}

IPtr<ISelectionMessage> TSelectionMessageList::Get(int Index) { return QueryAs<ISelectionMessage>(FList->Get(Index)); }

int TSelectionMessageList::GetCount() { return FList->GetCount(); }

void TSelectionMessageList::Add(const IPtr<ISelectionMessage>& Message) { FList->Add(Message); }

IPtr<ISelectionMessageList> SelectionMessageListOf(const IPtr<ISelectionEditorList>& SelectionEditorList) {
  IPtr<TSelectionMessageList> Result = New<TSelectionMessageList>();
  if (SelectionEditorList)
    for (int I = 0; I < SelectionEditorList->GetCount(); ++I)
      if (auto Message = QueryAs<ISelectionMessage>(SelectionEditorList->Get(I))) Result->Add(Message);
  return Result;
}

void UnregisterKilnEditors() noexcept { BaseRegistryKey.clear(); }

} // namespace formkit
