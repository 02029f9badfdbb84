//===- host/FormPainter.h - Drawing a form's components by kind -----------===//
//
// The part of the renderer that knows the controls: it walks a root's controls
// in z-order and draws each by its kind (button, label, edit, check box, panel,
// status bar, frame, or a plain box for any other), then the icons of the
// non-visual components and the grab handles of the selection, onto any
// `TRenderCanvas`.
//
// Example:
//   detail::CheckSelection(Form, Selection);
//   TPoint Size = RenderSize(Form);
//   detail::TCairoCanvas Canvas(Size.X, Size.Y);
//   detail::PaintForm(Canvas, Form, Selection, Size);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "host/RenderCanvas.h"
#include "platform/Classes.h"

#include <vector>

namespace formkit::detail {

/// Raises `ERenderError` `sRenderNotInRoot` for an entry of `Selection` that is neither
/// `Root` nor a component `Root` owns.
void CheckSelection(TComponent* Root, const std::vector<TComponent*>& Selection);

/// Draws `Root`, its components and the grab handles of `Selection` onto `Canvas`, which
/// is `Size` large, `RenderSize(Root)`. The selection must have passed `CheckSelection`.
void PaintForm(TRenderCanvas& Canvas, TComponent* Root, const std::vector<TComponent*>& Selection, TPoint Size);

} // namespace formkit::detail
