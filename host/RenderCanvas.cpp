//===- host/RenderCanvas.cpp - Drawing targets of the form renderer -------===//
#include "host/RenderCanvas.h"

#include "host/FormRender.h"

#include <cairo.h>

#include <algorithm>
#include <charconv>

namespace formkit::detail {

void TCairoDeleter::operator()(cairo_t* Cr) const noexcept { cairo_destroy(Cr); }
void TCairoDeleter::operator()(cairo_surface_t* Surface) const noexcept { cairo_surface_destroy(Surface); }

namespace {

double Red(std::int32_t C) { return (C & 0xFF) / 255.0; }
double Green(std::int32_t C) { return ((C >> 8) & 0xFF) / 255.0; }
double Blue(std::int32_t C) { return ((C >> 16) & 0xFF) / 255.0; }

/// A number as SVG wants it: shortest form, no exponent for the sizes a form has.
String Num(double Value) {
  char Buf[32];
  auto [End, Ec] = std::to_chars(Buf, Buf + sizeof Buf, Value, std::chars_format::fixed);
  if (Ec != std::errc()) return "0";
  String S(Buf, End);
  if (S.find('.') != String::npos) {
    while (S.back() == '0') S.pop_back();
    if (S.back() == '.') S.pop_back();
  }
  return S == "-0" ? "0" : S;
}

String Num(int Value) { return std::to_string(Value); }

String HexColor(std::int32_t C) {
  static const char Digits[] = "0123456789abcdef";
  String S = "#";
  for (int Shift : {0, 8, 16}) {
    int Byte = (C >> Shift) & 0xFF;
    S += Digits[Byte >> 4];
    S += Digits[Byte & 0xF];
  }
  return S;
}

/// The families cairo and SVG viewers know: the framework's default face is any sans.
String FamilyOf(const TRenderFont& Font) {
  return Font.Family == "Sans Serif" || Font.Family.empty() ? String("sans-serif") : Font.Family;
}

} // namespace

String XmlEscape(const String& Text) {
  String Out;
  Out.reserve(Text.size());
  for (char Ch : Text) {
    switch (Ch) {
    case '&': Out += "&amp;"; break;
    case '<': Out += "&lt;"; break;
    case '>': Out += "&gt;"; break;
    case '"': Out += "&quot;"; break;
    case '\'': Out += "&apos;"; break;
    default:
      // XML 1.0 has no way to write the other control characters.
      Out += static_cast<unsigned char>(Ch) < 0x20 && Ch != '\t' ? ' ' : Ch;
    }
  }
  return Out;
}

//===----------------------------------------------------------------------===//
// Measuring
//===----------------------------------------------------------------------===//

TRenderCanvas::TRenderCanvas()
    : FMeasureSurface(cairo_image_surface_create(CAIRO_FORMAT_RGB24, 1, 1)),
      FMeasure(cairo_create(FMeasureSurface.get())) {}

TRenderCanvas::~TRenderCanvas() = default;

void TRenderCanvas::SelectFont(cairo_t* Cr, const TRenderFont& Font) {
  cairo_select_font_face(Cr, FamilyOf(Font).c_str(), Font.Italic ? CAIRO_FONT_SLANT_ITALIC : CAIRO_FONT_SLANT_NORMAL,
                         Font.Bold ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL);
  cairo_set_font_size(Cr, Font.PixelSize);
}

TTextMetrics TRenderCanvas::Measure(const String& Line, const TRenderFont& Font) {
  SelectFont(FMeasure.get(), Font);
  cairo_font_extents_t FE;
  cairo_font_extents(FMeasure.get(), &FE);
  cairo_text_extents_t TE;
  cairo_text_extents(FMeasure.get(), Line.c_str(), &TE);
  return {TE.x_advance, FE.ascent, FE.descent};
}

//===----------------------------------------------------------------------===//
// cairo image
//===----------------------------------------------------------------------===//

TCairoCanvas::TCairoCanvas(int Width, int Height)
    : FSurface(cairo_image_surface_create(CAIRO_FORMAT_RGB24, Width, Height)), FCr(cairo_create(FSurface.get())) {
  Check();
}

void TCairoCanvas::Check() {
  cairo_status_t Status = cairo_surface_status(FSurface.get());
  if (Status == CAIRO_STATUS_SUCCESS) Status = cairo_status(FCr.get());
  if (Status != CAIRO_STATUS_SUCCESS) throw ERenderError(sRenderCairoFailed, cairo_status_to_string(Status));
}

void TCairoCanvas::SetColor(std::int32_t Color) {
  cairo_set_source_rgb(FCr.get(), Red(Color), Green(Color), Blue(Color));
}

void TCairoCanvas::BeginElement(const String&, const String&, const TRect& Bounds, bool Clip) {
  cairo_save(FCr.get());
  cairo_translate(FCr.get(), Bounds.Left, Bounds.Top);
  if (!Clip) return;
  cairo_rectangle(FCr.get(), 0, 0, Bounds.Width(), Bounds.Height());
  cairo_clip(FCr.get());
}

void TCairoCanvas::EndElement() { cairo_restore(FCr.get()); }

void TCairoCanvas::FillRect(const TRect& R, std::int32_t Color) {
  if (R.IsEmpty()) return;
  SetColor(Color);
  cairo_rectangle(FCr.get(), R.Left, R.Top, R.Width(), R.Height());
  cairo_fill(FCr.get());
}

void TCairoCanvas::Polyline(const std::vector<std::pair<double, double>>& Points, std::int32_t Color, double Width) {
  if (Points.size() < 2) return;
  SetColor(Color);
  cairo_set_line_width(FCr.get(), Width);
  cairo_move_to(FCr.get(), Points[0].first, Points[0].second);
  for (std::size_t I = 1; I < Points.size(); ++I) cairo_line_to(FCr.get(), Points[I].first, Points[I].second);
  cairo_stroke(FCr.get());
}

void TCairoCanvas::Text(double X, double Baseline, const String& Line, const TRenderFont& Font) {
  if (Line.empty()) return;
  SelectFont(FCr.get(), Font);
  SetColor(Font.Color);
  cairo_move_to(FCr.get(), X, Baseline);
  cairo_show_text(FCr.get(), Line.c_str());
  if (!Font.Underline && !Font.StrikeOut) return;
  double Width = Measure(Line, Font).Width;
  double Thickness = std::max(1.0, Font.PixelSize / 14);
  auto Rule = [&](double Y) {
    cairo_rectangle(FCr.get(), X, Y, Width, Thickness);
    cairo_fill(FCr.get());
  };
  if (Font.Underline) Rule(Baseline + Thickness);
  if (Font.StrikeOut) Rule(Baseline - Font.PixelSize * 0.3);
}

String TCairoCanvas::Finish() {
  cairo_surface_flush(FSurface.get());
  Check();
  String Png;
  auto Append = +[](void* Closure, const unsigned char* Data, unsigned int Length) -> cairo_status_t {
    static_cast<String*>(Closure)->append(reinterpret_cast<const char*>(Data), Length);
    return CAIRO_STATUS_SUCCESS;
  };
  cairo_status_t Status = cairo_surface_write_to_png_stream(FSurface.get(), Append, &Png);
  if (Status != CAIRO_STATUS_SUCCESS) throw ERenderError(sRenderCairoFailed, cairo_status_to_string(Status));
  return Png;
}

//===----------------------------------------------------------------------===//
// SVG document
//===----------------------------------------------------------------------===//

TSvgCanvas::TSvgCanvas(int Width, int Height) {
  FText = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
  FText += "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"" + Num(Width) + "\" height=\"" + Num(Height) +
           "\" viewBox=\"0 0 " + Num(Width) + " " + Num(Height) + "\">\n";
}

void TSvgCanvas::Indent() {
  // One step for the document, one for each open element and one for each inner viewport.
  auto Viewports = static_cast<std::size_t>(std::count(FOpen.begin(), FOpen.end(), true));
  FText.append(2 * (1 + FOpen.size() + Viewports), ' ');
}

void TSvgCanvas::BeginElement(const String& Id, const String& Kind, const TRect& Bounds, bool Clip) {
  Indent();
  FText += "<g id=\"" + XmlEscape(Id) + "\" class=\"" + XmlEscape(Kind) + "\" transform=\"translate(" +
           Num(Bounds.Left) + "," + Num(Bounds.Top) + ")\">\n";
  FOpen.push_back(false);
  if (Clip) {
    // A nested viewport clips without a clip path, which would need an id of its own.
    Indent();
    FOpen.back() = true;
    FText += "<svg width=\"" + Num(Bounds.Width()) + "\" height=\"" + Num(Bounds.Height()) +
             "\" overflow=\"hidden\">\n";
  }
}

void TSvgCanvas::EndElement() {
  if (FOpen.back()) {
    FOpen.back() = false;
    Indent();
    FText += "</svg>\n";
  }
  FOpen.pop_back();
  Indent();
  FText += "</g>\n";
}

void TSvgCanvas::FillRect(const TRect& R, std::int32_t Color) {
  if (R.IsEmpty()) return;
  Indent();
  FText += "<rect x=\"" + Num(R.Left) + "\" y=\"" + Num(R.Top) + "\" width=\"" + Num(R.Width()) + "\" height=\"" +
           Num(R.Height()) + "\" fill=\"" + HexColor(Color) + "\"/>\n";
}

void TSvgCanvas::Polyline(const std::vector<std::pair<double, double>>& Points, std::int32_t Color, double Width) {
  if (Points.size() < 2) return;
  Indent();
  FText += "<polyline points=\"";
  for (std::size_t I = 0; I < Points.size(); ++I)
    FText += (I ? " " : "") + Num(Points[I].first) + "," + Num(Points[I].second);
  FText += "\" fill=\"none\" stroke=\"" + HexColor(Color) + "\" stroke-width=\"" + Num(Width) + "\"/>\n";
}

void TSvgCanvas::Text(double X, double Baseline, const String& Line, const TRenderFont& Font) {
  if (Line.empty()) return;
  Indent();
  FText += "<text x=\"" + Num(X) + "\" y=\"" + Num(Baseline) + "\" font-family=\"" + XmlEscape(FamilyOf(Font)) +
           "\" font-size=\"" + Num(Font.PixelSize) + "\" fill=\"" + HexColor(Font.Color) + "\"";
  if (Font.Bold) FText += " font-weight=\"bold\"";
  if (Font.Italic) FText += " font-style=\"italic\"";
  if (Font.Underline || Font.StrikeOut)
    FText += String(" text-decoration=\"") + (Font.Underline ? "underline" : "") +
             (Font.Underline && Font.StrikeOut ? " " : "") + (Font.StrikeOut ? "line-through" : "") + "\"";
  FText += " xml:space=\"preserve\">" + XmlEscape(Line) + "</text>\n";
}

String TSvgCanvas::Finish() {
  while (!FOpen.empty()) EndElement();
  FText += "</svg>\n";
  return std::move(FText);
}

} // namespace formkit::detail
