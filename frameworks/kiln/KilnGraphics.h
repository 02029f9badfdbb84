//===- frameworks/kiln/KilnGraphics.h - Colours, fonts, pens, canvases ---===//
//
// Colours are integers: plain ones hold blue, green and red bytes (0x00BBGGRR),
// system colours carry `clSystemColor` and an index, and each has a name for the
// text form and the inspector. `TFont`, `TPen` and `TBrush` are persistents that
// a control owns and streams as sub-objects. `TCanvas` draws nowhere: it records
// each drawing call as a line of text, so a test can read what was drawn.
//
// Example:
//   TCanvas* C = new TCanvas;
//   C->Brush()->SetColor(clRed);
//   C->Rectangle(0, 0, 10, 10);
//   C->Lines();          // {"Rectangle(0,0,10,10)"}
//   ColorToString(clBtnFace);   // "clBtnFace"
//   C->Destroy();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

#include <climits>

namespace formkit {

//===----------------------------------------------------------------------===//
// Colours
//===----------------------------------------------------------------------===//

/// A colour: 0x00BBGGRR, a system colour (`clSystemColor` | index), `clNone` or `clDefault`.
using TColor = std::int32_t;
FK_SUBRANGE(TColor, std::int32_t, INT32_MIN, INT32_MAX)

inline constexpr TColor clSystemColor = static_cast<TColor>(0xFF000000u);
inline constexpr TColor clScrollBar = clSystemColor | 0;
inline constexpr TColor clBackground = clSystemColor | 1;
inline constexpr TColor clActiveCaption = clSystemColor | 2;
inline constexpr TColor clInactiveCaption = clSystemColor | 3;
inline constexpr TColor clMenu = clSystemColor | 4;
inline constexpr TColor clWindow = clSystemColor | 5;
inline constexpr TColor clWindowFrame = clSystemColor | 6;
inline constexpr TColor clMenuText = clSystemColor | 7;
inline constexpr TColor clWindowText = clSystemColor | 8;
inline constexpr TColor clCaptionText = clSystemColor | 9;
inline constexpr TColor clHighlight = clSystemColor | 13;
inline constexpr TColor clHighlightText = clSystemColor | 14;
inline constexpr TColor clBtnFace = clSystemColor | 15;
inline constexpr TColor clBtnShadow = clSystemColor | 16;
inline constexpr TColor clGrayText = clSystemColor | 17;
inline constexpr TColor clBtnText = clSystemColor | 18;
inline constexpr TColor clBtnHighlight = clSystemColor | 20;
inline constexpr TColor clInfoText = clSystemColor | 23;
inline constexpr TColor clInfoBk = clSystemColor | 24;

inline constexpr TColor clBlack = 0x000000;
inline constexpr TColor clMaroon = 0x000080;
inline constexpr TColor clGreen = 0x008000;
inline constexpr TColor clOlive = 0x008080;
inline constexpr TColor clNavy = 0x800000;
inline constexpr TColor clPurple = 0x800080;
inline constexpr TColor clTeal = 0x808000;
inline constexpr TColor clGray = 0x808080;
inline constexpr TColor clSilver = 0xC0C0C0;
inline constexpr TColor clRed = 0x0000FF;
inline constexpr TColor clLime = 0x00FF00;
inline constexpr TColor clYellow = 0x00FFFF;
inline constexpr TColor clBlue = 0xFF0000;
inline constexpr TColor clFuchsia = 0xFF00FF;
inline constexpr TColor clAqua = 0xFFFF00;
inline constexpr TColor clWhite = 0xFFFFFF;
/// No colour: nothing is painted.
inline constexpr TColor clNone = 0x1FFFFFFF;
/// The colour the control would choose itself.
inline constexpr TColor clDefault = 0x20000000;

/// The name of a named colour ("clBtnFace"); false when it has none.
FK_API bool ColorToIdent(TColor Color, String& Ident);
/// The colour of a name, without regard to case; false when the name is unknown.
FK_API bool IdentToColor(std::string_view Ident, TColor& Color);
/// The name of a named colour, else "$00BBGGRR" in hexadecimal.
FK_API String ColorToString(TColor Color);
/// A colour name or a number (decimal or `$` hexadecimal); raises `EConvertError`
/// "'%s' is not a valid integer value" for anything else.
FK_API TColor StringToColor(std::string_view Text);
/// The plain colour behind a system colour (the headless palette); other values unchanged.
FK_API TColor ColorToRGB(TColor Color);
/// Calls `Proc` with the name of every named colour, in a fixed order.
FK_API void GetColorValues(const std::function<void(const String& Name)>& Proc);

//===----------------------------------------------------------------------===//
// Font, pen, brush
//===----------------------------------------------------------------------===//

FK_ENUM(TFontStyle, std::uint8_t, fsBold, fsItalic, fsUnderline, fsStrikeOut)
FK_SET(TFontStyles, TFontStyle)
FK_ENUM(TPenStyle, std::uint8_t, psSolid, psDash, psDot, psDashDot, psDashDotDot, psClear)
FK_ENUM(TBrushStyle, std::uint8_t, bsSolid, bsClear, bsHorizontal, bsVertical, bsFDiagonal,
        bsBDiagonal, bsCross, bsDiagCross)

/// The face a new font has.
inline constexpr const char* DefaultFontName = "Sans Serif";
/// The size in points a new font has.
inline constexpr int DefaultFontSize = 9;

/// A persistent that tells its owner of every change through `OnChange`.
class FK_API TGraphicsObject : public TPersistent {
  FK_CLASS(TGraphicsObject, TPersistent)
  /// Called after each change; the owner binds it.
  TNotifyEvent OnChange;

protected:
  void Changed();
};

/// A typeface, its size in points, colour and style. Owned by a control or a canvas.
class FK_API TFont : public TGraphicsObject {
  FK_CLASS(TFont, TGraphicsObject)

  const String& Name() const noexcept { return FName; }
  void SetName(const String& Value);
  int Size() const noexcept { return FSize; }
  /// Raises `EInvalidOperation` for a size below 1.
  void SetSize(int Value);
  TColor Color() const noexcept { return FColor; }
  void SetColor(TColor Value);
  TFontStyles Style() const noexcept { return FStyle; }
  void SetStyle(TFontStyles Value);
  /// The height in pixels of a line at `PPI` pixels per inch.
  int PixelHeight(int PPI = 96) const noexcept;
  /// Copies another font's face, size, colour and style; one change notification.
  void Assign(TPersistent* Source) override;
  /// True when face, size, colour and style are the same.
  bool Equals(const TFont* Other) const noexcept;

private:
  String FName = DefaultFontName;
  int FSize = DefaultFontSize;
  TColor FColor = clWindowText;
  TFontStyles FStyle;
};

/// How lines are drawn.
class FK_API TPen : public TGraphicsObject {
  FK_CLASS(TPen, TGraphicsObject)
  TColor Color() const noexcept { return FColor; }
  void SetColor(TColor Value);
  int Width() const noexcept { return FWidth; }
  void SetWidth(int Value);
  TPenStyle Style() const noexcept { return FStyle; }
  void SetStyle(TPenStyle Value);
  void Assign(TPersistent* Source) override;

private:
  TColor FColor = clBlack;
  int FWidth = 1;
  TPenStyle FStyle = psSolid;
};

/// How areas are filled.
class FK_API TBrush : public TGraphicsObject {
  FK_CLASS(TBrush, TGraphicsObject)
  TColor Color() const noexcept { return FColor; }
  void SetColor(TColor Value);
  TBrushStyle Style() const noexcept { return FStyle; }
  void SetStyle(TBrushStyle Value);
  void Assign(TPersistent* Source) override;

private:
  TColor FColor = clWhite;
  TBrushStyle FStyle = bsSolid;
};

//===----------------------------------------------------------------------===//
// Canvas
//===----------------------------------------------------------------------===//

/// A drawing surface that records its calls. Coordinates are recorded as given; text
/// metrics come from the font: a line is `TFont::PixelHeight` high and each character
/// half of that wide.
class FK_API TCanvas : public TPersistent {
  FK_CLASS(TCanvas, TPersistent)

  TCanvas();
  void BeforeDestruction() override;

  /// The canvas's own font, pen and brush.
  TFont* Font() const noexcept { return FFont.Get(); }
  TPen* Pen() const noexcept { return FPen.Get(); }
  TBrush* Brush() const noexcept { return FBrush.Get(); }
  TPoint PenPos() const noexcept { return FPenPos; }

  /// Records "MoveTo(X,Y)".
  void MoveTo(int X, int Y);
  /// Records "LineTo(X,Y)" and moves the pen there.
  void LineTo(int X, int Y);
  /// Records "Rectangle(L,T,R,B)".
  void Rectangle(int Left, int Top, int Right, int Bottom);
  void Rectangle(const TRect& R) { Rectangle(R.Left, R.Top, R.Right, R.Bottom); }
  /// Records "FillRect(L,T,R,B)".
  void FillRect(const TRect& R);
  /// Records "FrameRect(L,T,R,B)".
  void FrameRect(const TRect& R);
  /// Records "Ellipse(L,T,R,B)".
  void Ellipse(int Left, int Top, int Right, int Bottom);
  /// Records "TextOut(X,Y,\"Text\")".
  void TextOut(int X, int Y, const String& Text);
  /// Records "TextRect(L,T,R,B,X,Y,\"Text\")".
  void TextRect(const TRect& R, int X, int Y, const String& Text);
  /// Records "Draw(X,Y,Name)": a picture drawn by name.
  void Draw(int X, int Y, const String& PictureName);
  /// Records "StretchDraw(L,T,R,B,Name)": a picture drawn by name, scaled into `R`.
  void StretchDraw(const TRect& R, const String& PictureName);
  /// Text metrics in pixels at the canvas's pixels per inch.
  int TextWidth(const String& Text) const;
  int TextHeight(const String& Text) const;
  TPoint TextExtent(const String& Text) const { return {TextWidth(Text), TextHeight(Text)}; }
  /// Pixels per inch of the device drawn on (96 unless set).
  int PixelsPerInch() const noexcept { return FPixelsPerInch; }
  void SetPixelsPerInch(int Value) noexcept { FPixelsPerInch = Value > 0 ? Value : 96; }

  /// What was drawn, one call a line, oldest first.
  const std::vector<String>& Lines() const noexcept { return FLines; }
  /// All lines joined with "\n" after each one.
  String Text() const;
  /// Forgets what was drawn.
  void ClearLines() noexcept { FLines.clear(); }

private:
  void Record(String Line);
  TObjectGuard<TFont> FFont;
  TObjectGuard<TPen> FPen;
  TObjectGuard<TBrush> FBrush;
  TPoint FPenPos;
  int FPixelsPerInch = 96;
  std::vector<String> FLines;
};

//===----------------------------------------------------------------------===//
// Bitmap
//===----------------------------------------------------------------------===//

/// A picture of a size, drawn on through its own canvas (which records the calls).
class FK_API TBitmap : public TPersistent {
  FK_CLASS(TBitmap, TPersistent)

  TBitmap() : FCanvas(new TCanvas) {}
  void BeforeDestruction() override;

  int Width() const noexcept { return FWidth; }
  int Height() const noexcept { return FHeight; }
  /// Gives the picture a new size; negative sizes count as 0. What was drawn is kept.
  void SetSize(int Width, int Height) noexcept;
  /// The canvas, the bitmap's own.
  TCanvas* Canvas() const noexcept { return FCanvas.Get(); }

private:
  TObjectGuard<TCanvas> FCanvas;
  int FWidth = 0;
  int FHeight = 0;
};

} // namespace formkit
