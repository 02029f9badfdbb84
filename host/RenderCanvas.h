//===- host/RenderCanvas.h - Drawing targets of the form renderer ---------===//
//
// The few drawing operations the form painter needs, and the two targets that
// carry them out: a cairo image (for PNG files) and an SVG document written as
// plain XML text. Both measure text with the same cairo toy font engine, so a
// caption is placed the same way in either.
//
// Each component drawn is one element: `BeginElement` opens it at its bounds
// (coordinates inside start at its top-left corner), `EndElement` closes it.
// Elements nest as the controls do; an element that clips hides whatever its
// content draws outside its bounds.
//
// Example:
//   detail::TSvgCanvas Svg(320, 200);
//   Svg.BeginElement("Button1", "TButton", Bounds(8, 8, 75, 25), true);
//   Svg.FillRect(Rect(0, 0, 75, 25), 0xF0F0F0);
//   Svg.EndElement();
//   String Document = Svg.Finish();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <memory>
#include <vector>

typedef struct _cairo cairo_t;
typedef struct _cairo_surface cairo_surface_t;

namespace formkit::detail {

/// A typeface as the targets draw it: family, size in pixels, style and a plain colour.
struct TRenderFont {
  String Family;
  double PixelSize = 12;
  bool Bold = false;
  bool Italic = false;
  bool Underline = false;
  bool StrikeOut = false;
  /// 0x00BBGGRR, never a system colour.
  std::int32_t Color = 0;
};

/// How much room a line of text takes, in pixels.
struct TTextMetrics {
  double Width = 0;
  double Ascent = 0;
  double Descent = 0;
};

/// Frees cairo objects held by `std::unique_ptr`.
struct TCairoDeleter {
  void operator()(cairo_t* Cr) const noexcept;
  void operator()(cairo_surface_t* Surface) const noexcept;
};
using TCairoContext = std::unique_ptr<cairo_t, TCairoDeleter>;
using TCairoSurface = std::unique_ptr<cairo_surface_t, TCairoDeleter>;

//===----------------------------------------------------------------------===//
// The drawing interface
//===----------------------------------------------------------------------===//

/// Where the painter draws. Colours are plain 0x00BBGGRR values.
class TRenderCanvas {
public:
  TRenderCanvas();
  virtual ~TRenderCanvas();
  TRenderCanvas(const TRenderCanvas&) = delete;
  TRenderCanvas& operator=(const TRenderCanvas&) = delete;

  /// Opens the element of one component at `Bounds`, given in the current coordinates.
  /// `Id` and `Kind` name it (its name and class); with `Clip` nothing drawn inside
  /// shows outside `Bounds`.
  virtual void BeginElement(const String& Id, const String& Kind, const TRect& Bounds, bool Clip) = 0;
  /// Closes the element opened last.
  virtual void EndElement() = 0;
  /// Fills a rectangle; an empty one draws nothing.
  virtual void FillRect(const TRect& R, std::int32_t Color) = 0;
  /// Draws a line through `Points` of `Width` pixels, centred on the points.
  virtual void Polyline(const std::vector<std::pair<double, double>>& Points, std::int32_t Color,
                        double Width) = 0;
  /// Writes one line of text with its baseline's start at (`X`, `Baseline`).
  virtual void Text(double X, double Baseline, const String& Line, const TRenderFont& Font) = 0;

  /// The room `Line` takes in `Font`. Cost: one cairo text measure.
  TTextMetrics Measure(const String& Line, const TRenderFont& Font);

protected:
  /// Makes `Font` the current font of `Cr`.
  static void SelectFont(cairo_t* Cr, const TRenderFont& Font);

private:
  TCairoSurface FMeasureSurface;
  TCairoContext FMeasure;
};

//===----------------------------------------------------------------------===//
// Targets
//===----------------------------------------------------------------------===//

/// An opaque cairo image of a fixed size.
class TCairoCanvas final : public TRenderCanvas {
public:
  /// Raises `ERenderError` when cairo cannot make an image of that size.
  TCairoCanvas(int Width, int Height);
  void BeginElement(const String& Id, const String& Kind, const TRect& Bounds, bool Clip) override;
  void EndElement() override;
  void FillRect(const TRect& R, std::int32_t Color) override;
  void Polyline(const std::vector<std::pair<double, double>>& Points, std::int32_t Color, double Width) override;
  void Text(double X, double Baseline, const String& Line, const TRenderFont& Font) override;
  /// The image encoded as PNG. Raises `ERenderError` when cairo failed on the way.
  [[nodiscard]] String Finish();

private:
  void SetColor(std::int32_t Color);
  void Check();
  TCairoSurface FSurface;
  TCairoContext FCr;
};

/// An SVG document of a fixed size, built as text.
class TSvgCanvas final : public TRenderCanvas {
public:
  TSvgCanvas(int Width, int Height);
  void BeginElement(const String& Id, const String& Kind, const TRect& Bounds, bool Clip) override;
  void EndElement() override;
  void FillRect(const TRect& R, std::int32_t Color) override;
  void Polyline(const std::vector<std::pair<double, double>>& Points, std::int32_t Color, double Width) override;
  void Text(double X, double Baseline, const String& Line, const TRenderFont& Font) override;
  /// The whole document; the canvas is spent afterwards.
  [[nodiscard]] String Finish();

private:
  void Indent();
  String FText;
  /// For each open element, whether it clips (and so has an inner viewport to close).
  std::vector<bool> FOpen;
};

/// `Text` with `&`, `<`, `>`, quotes and the control characters XML forbids made safe.
String XmlEscape(const String& Text);

} // namespace formkit::detail
