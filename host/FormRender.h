//===- host/FormRender.h - Pictures of a form: PNG and SVG ----------------===//
//
// Draws a live root (a form, a frame or a data module of the Kiln framework)
// as the design surface shows it: the form's client area at its own size, each
// control drawn by kind with its caption, children clipped to their parent and
// stacked in its z-order, the non-visual components as icons at their design
// places, and grab handles around the selection. The picture is a PNG made with
// cairo or an SVG document in which each component is one `<g>` element whose
// `id` is its name and `class` its class name, nested as the controls nest.
//
// Example:
//   RenderFormToFile(Form, {Button1}, "build/demo/Form1.png");
//   String Svg = RenderFormToSvg(Form, {});
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnGraphics.h"
#include "platform/Classes.h"

#include <vector>

namespace formkit {

/// What the renderer raises; nothing is written when it does.
FK_EXCEPTION(ERenderError, Exception);

FK_RESOURCESTRING(sRenderUnknownFormat, "Cannot render to \"%s\": the file name must end in .png or .svg");
FK_RESOURCESTRING(sRenderCannotWrite, "Cannot write \"%s\": %s");
FK_RESOURCESTRING(sRenderNotARoot, "%s is not a form, a frame or a data module");
FK_RESOURCESTRING(sRenderNoArea, "%s has no area to draw (%d by %d)");
FK_RESOURCESTRING(sRenderNotInRoot, "%s is not a component of %s");
FK_RESOURCESTRING(sRenderCairoFailed, "The picture cannot be drawn: %s");

/// The picture formats, chosen by a file name's extension.
enum TRenderFormat : std::uint8_t { rfPng, rfSvg };

/// The colour of grab handles: filled squares on a single selected component, framed
/// ones around each of several.
inline constexpr TColor RenderHandleColor = clBlack;

/// The format of a file name ending in ".png" or ".svg", without regard to case.
/// Raises `ERenderError` `sRenderUnknownFormat` for any other.
[[nodiscard]] FK_API TRenderFormat RenderFormatOf(const String& FileName);

/// The size of the picture of `Root`: a form's client size, a frame's bounds, a data
/// module's design size (or, when it has none, room for its icons). Raises
/// `ERenderError` for a component that is no root (`sRenderNotARoot`) and for an empty
/// area (`sRenderNoArea`).
[[nodiscard]] FK_API TPoint RenderSize(TComponent* Root);

/// The picture of `Root` as the bytes of a PNG file, with grab handles around each
/// component of `Selection` (the root or components it owns; none are owned). Raises
/// `ERenderError` as `RenderSize` does, `sRenderNotInRoot` for a selected component of
/// another root, and `sRenderCairoFailed` when cairo cannot make the image (a side
/// longer than 32767 pixels). Cost: one pass over the controls, plus one image of the
/// form's size.
[[nodiscard]] FK_API String RenderFormToPng(TComponent* Root, const std::vector<TComponent*>& Selection);

/// The picture of `Root` as an SVG document, raising as `RenderFormToPng` does.
[[nodiscard]] FK_API String RenderFormToSvg(TComponent* Root, const std::vector<TComponent*>& Selection);

/// Draws `Root` into `FileName` in the format its extension names. The file is written
/// beside itself first and moved into place, so a failure leaves no file of that name,
/// or the one that was there, untouched. Raises what the renderers raise, and
/// `ERenderError` `sRenderCannotWrite` with the system's reason when the file cannot
/// be written.
FK_API void RenderFormToFile(TComponent* Root, const std::vector<TComponent*>& Selection, const String& FileName);

} // namespace formkit
