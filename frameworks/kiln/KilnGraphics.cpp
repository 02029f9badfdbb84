//===- frameworks/kiln/KilnGraphics.cpp - Colours, fonts, canvases -------===//
#include "frameworks/kiln/KilnGraphics.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SInvalidFontSize, "Font size %d is not valid: a font is at least 1 point");
FK_RESOURCESTRING(SInvalidPenWidth, "Pen width %d is not valid: a pen is at least 1 pixel wide");

//===----------------------------------------------------------------------===//
// Colours
//===----------------------------------------------------------------------===//

namespace {
struct TColorName {
  TColor Value;
  const char* Name;
  /// What a system colour looks like in the headless palette.
  TColor Rgb;
};

const TColorName ColorNames[] = {
    {clBlack, "clBlack", clBlack},
    {clMaroon, "clMaroon", clMaroon},
    {clGreen, "clGreen", clGreen},
    {clOlive, "clOlive", clOlive},
    {clNavy, "clNavy", clNavy},
    {clPurple, "clPurple", clPurple},
    {clTeal, "clTeal", clTeal},
    {clGray, "clGray", clGray},
    {clSilver, "clSilver", clSilver},
    {clRed, "clRed", clRed},
    {clLime, "clLime", clLime},
    {clYellow, "clYellow", clYellow},
    {clBlue, "clBlue", clBlue},
    {clFuchsia, "clFuchsia", clFuchsia},
    {clAqua, "clAqua", clAqua},
    {clWhite, "clWhite", clWhite},
    {clScrollBar, "clScrollBar", 0xC8C8C8},
    {clBackground, "clBackground", 0x000000},
    {clActiveCaption, "clActiveCaption", 0xD1B499},
    {clInactiveCaption, "clInactiveCaption", 0xDBCDBF},
    {clMenu, "clMenu", 0xF0F0F0},
    {clWindow, "clWindow", 0xFFFFFF},
    {clWindowFrame, "clWindowFrame", 0x646464},
    {clMenuText, "clMenuText", 0x000000},
    {clWindowText, "clWindowText", 0x000000},
    {clCaptionText, "clCaptionText", 0x000000},
    {clHighlight, "clHighlight", 0xD77800},
    {clHighlightText, "clHighlightText", 0xFFFFFF},
    {clBtnFace, "clBtnFace", 0xF0F0F0},
    {clBtnShadow, "clBtnShadow", 0xA0A0A0},
    {clGrayText, "clGrayText", 0x6D6D6D},
    {clBtnText, "clBtnText", 0x000000},
    {clBtnHighlight, "clBtnHighlight", 0xFFFFFF},
    {clInfoText, "clInfoText", 0x000000},
    {clInfoBk, "clInfoBk", 0xE1FFFF},
    {clNone, "clNone", clNone},
    {clDefault, "clDefault", clDefault},
};
} // namespace

bool ColorToIdent(TColor Color, String& Ident) {
  for (const auto& C : ColorNames)
    if (C.Value == Color) {
      Ident = C.Name;
      return true;
    }
  return false;
}

bool IdentToColor(std::string_view Ident, TColor& Color) {
  for (const auto& C : ColorNames)
    if (SameText(C.Name, Ident)) {
      Color = C.Value;
      return true;
    }
  return false;
}

String ColorToString(TColor Color) {
  String Name;
  if (ColorToIdent(Color, Name)) return Name;
  return Format("$%.8x", static_cast<unsigned>(Color));
}

TColor StringToColor(std::string_view Text) {
  TColor Color;
  if (IdentToColor(Text, Color)) return Color;
  long long V = StrToInt64(Text);
  // Eight hexadecimal digits may name a system colour, whose top bit is set.
  if (V > INT32_MAX && V <= static_cast<long long>(UINT32_MAX)) return static_cast<TColor>(static_cast<std::uint32_t>(V));
  if (V < INT32_MIN || V > INT32_MAX) throw EConvertError("'%s' is not a valid integer value", String(Text));
  return static_cast<TColor>(V);
}

TColor ColorToRGB(TColor Color) {
  if ((Color & clSystemColor) != clSystemColor) return Color;
  for (const auto& C : ColorNames)
    if (C.Value == Color) return C.Rgb;
  return clBlack;
}

void GetColorValues(const std::function<void(const String& Name)>& Proc) {
  for (const auto& C : ColorNames) Proc(C.Name);
}

//===----------------------------------------------------------------------===//
// Graphics objects
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TGraphicsObject, "KilnGraphics") {}

void TGraphicsObject::Changed() {
  if (OnChange) OnChange(this);
}

FK_IMPLEMENT(TFont, "KilnGraphics") {
  B.Property("Color", &TFont::Color, &TFont::SetColor).Type(&TypeInfo_TColor).Default(clWindowText);
  B.Property("Name", &TFont::Name, &TFont::SetName)
      .Stored(+[](TObject* O) { return static_cast<TFont*>(O)->Name() != DefaultFontName; });
  B.Property("Size", &TFont::Size, &TFont::SetSize).Default(DefaultFontSize);
  B.Property("Style", &TFont::Style, &TFont::SetStyle).Default(TFontStyles{});
}

void TFont::SetName(const String& Value) {
  if (FName == Value) return;
  FName = Value;
  Changed();
}

void TFont::SetSize(int Value) {
  if (Value < 1) throw EInvalidOperation(SInvalidFontSize, Value);
  if (FSize == Value) return;
  FSize = Value;
  Changed();
}

void TFont::SetColor(TColor Value) {
  if (FColor == Value) return;
  FColor = Value;
  Changed();
}

void TFont::SetStyle(TFontStyles Value) {
  if (FStyle == Value) return;
  FStyle = Value;
  Changed();
}

int TFont::PixelHeight(int PPI) const noexcept { return MulDiv(FSize, PPI, 72); }

void TFont::Assign(TPersistent* Source) {
  auto* F = dynamic_cast<TFont*>(Source);
  if (!F) {
    inherited::Assign(Source);
    return;
  }
  if (Equals(F)) return;
  FName = F->FName;
  FSize = F->FSize;
  FColor = F->FColor;
  FStyle = F->FStyle;
  Changed();
}

bool TFont::Equals(const TFont* Other) const noexcept {
  return Other && FName == Other->FName && FSize == Other->FSize && FColor == Other->FColor &&
         FStyle == Other->FStyle;
}

FK_IMPLEMENT(TPen, "KilnGraphics") {
  B.Property("Color", &TPen::Color, &TPen::SetColor).Type(&TypeInfo_TColor).Default(clBlack);
  B.Property("Style", &TPen::Style, &TPen::SetStyle).Default(psSolid);
  B.Property("Width", &TPen::Width, &TPen::SetWidth).Default(1);
}

void TPen::SetColor(TColor Value) {
  if (FColor == Value) return;
  FColor = Value;
  Changed();
}

void TPen::SetWidth(int Value) {
  if (Value < 1) throw EInvalidOperation(SInvalidPenWidth, Value);
  if (FWidth == Value) return;
  FWidth = Value;
  Changed();
}

void TPen::SetStyle(TPenStyle Value) {
  if (FStyle == Value) return;
  FStyle = Value;
  Changed();
}

void TPen::Assign(TPersistent* Source) {
  auto* P = dynamic_cast<TPen*>(Source);
  if (!P) {
    inherited::Assign(Source);
    return;
  }
  FColor = P->FColor;
  FWidth = P->FWidth;
  FStyle = P->FStyle;
  Changed();
}

FK_IMPLEMENT(TBrush, "KilnGraphics") {
  B.Property("Color", &TBrush::Color, &TBrush::SetColor).Type(&TypeInfo_TColor).Default(clWhite);
  B.Property("Style", &TBrush::Style, &TBrush::SetStyle).Default(bsSolid);
}

void TBrush::SetColor(TColor Value) {
  if (FColor == Value) return;
  FColor = Value;
  Changed();
}

void TBrush::SetStyle(TBrushStyle Value) {
  if (FStyle == Value) return;
  FStyle = Value;
  Changed();
}

void TBrush::Assign(TPersistent* Source) {
  auto* B = dynamic_cast<TBrush*>(Source);
  if (!B) {
    inherited::Assign(Source);
    return;
  }
  FColor = B->FColor;
  FStyle = B->FStyle;
  Changed();
}

//===----------------------------------------------------------------------===//
// Canvas
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCanvas, "KilnGraphics") {}

TCanvas::TCanvas() : FFont(new TFont), FPen(new TPen), FBrush(new TBrush) {}

void TCanvas::BeforeDestruction() {
  FFont.Reset();
  FPen.Reset();
  FBrush.Reset();
  inherited::BeforeDestruction();
}

void TCanvas::Record(String Line) { FLines.push_back(std::move(Line)); }

void TCanvas::MoveTo(int X, int Y) {
  FPenPos = {X, Y};
  Record(Format("MoveTo(%d,%d)", X, Y));
}

void TCanvas::LineTo(int X, int Y) {
  FPenPos = {X, Y};
  Record(Format("LineTo(%d,%d)", X, Y));
}

void TCanvas::Rectangle(int Left, int Top, int Right, int Bottom) {
  Record(Format("Rectangle(%d,%d,%d,%d)", Left, Top, Right, Bottom));
}

void TCanvas::FillRect(const TRect& R) {
  Record(Format("FillRect(%d,%d,%d,%d)", R.Left, R.Top, R.Right, R.Bottom));
}

void TCanvas::FrameRect(const TRect& R) {
  Record(Format("FrameRect(%d,%d,%d,%d)", R.Left, R.Top, R.Right, R.Bottom));
}

void TCanvas::Ellipse(int Left, int Top, int Right, int Bottom) {
  Record(Format("Ellipse(%d,%d,%d,%d)", Left, Top, Right, Bottom));
}

void TCanvas::TextOut(int X, int Y, const String& Text) {
  Record(Format("TextOut(%d,%d,\"%s\")", X, Y, Text));
  FPenPos = {X + TextWidth(Text), Y};
}

void TCanvas::TextRect(const TRect& R, int X, int Y, const String& Text) {
  Record(Format("TextRect(%d,%d,%d,%d,%d,%d,\"%s\")", R.Left, R.Top, R.Right, R.Bottom, X, Y, Text));
}

void TCanvas::Draw(int X, int Y, const String& PictureName) { Record(Format("Draw(%d,%d,%s)", X, Y, PictureName)); }

void TCanvas::StretchDraw(const TRect& R, const String& PictureName) {
  Record(Format("StretchDraw(%d,%d,%d,%d,%s)", R.Left, R.Top, R.Right, R.Bottom, PictureName));
}

int TCanvas::TextWidth(const String& Text) const {
  int Chars = 0;
  for (unsigned char C : Text)
    if ((C & 0xC0) != 0x80) ++Chars; // count characters, not UTF-8 continuation bytes
  return Chars * (FFont->PixelHeight(FPixelsPerInch) / 2);
}

int TCanvas::TextHeight(const String&) const { return FFont->PixelHeight(FPixelsPerInch); }

String TCanvas::Text() const {
  String S;
  for (const String& L : FLines) {
    S += L;
    S += '\n';
  }
  return S;
}

//===----------------------------------------------------------------------===//
// TBitmap
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBitmap, "KilnGraphics") {}

void TBitmap::BeforeDestruction() {
  FCanvas.Reset();
  inherited::BeforeDestruction();
}

void TBitmap::SetSize(int Width, int Height) noexcept {
  FWidth = std::max(Width, 0);
  FHeight = std::max(Height, 0);
}

} // namespace formkit
