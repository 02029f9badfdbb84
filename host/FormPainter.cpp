//===- host/FormPainter.cpp - Drawing a form's components by kind ---------===//
#include "host/FormPainter.h"

#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "host/FormRender.h"

#include <algorithm>
#include <optional>

namespace formkit {

namespace {

/// The side of a check box's box.
constexpr int CheckBoxSize = 13;
/// Room below an icon for its name, when a data module's size has to be found.
constexpr int IconCaptionRoom = 20;
/// The space kept right of and below the last icon in that case.
constexpr int IconMargin = 8;

std::int32_t Rgb(TColor C) { return ColorToRGB(C) & 0xFFFFFF; }

/// The plain colour to paint with: `Default` for `clDefault`, none for `clNone`.
std::optional<std::int32_t> PaintColor(TColor C, TColor Default) {
  if (C == clNone) return std::nullopt;
  return Rgb(C == clDefault ? Default : C);
}

detail::TRenderFont FontOf(const TControl* Control) {
  const TFont* F = Control->Font();
  detail::TRenderFont R;
  R.Family = F->Name();
  R.PixelSize = F->Size() * Control->CurrentPPI() / 72.0;
  R.Bold = F->Style().Contains(fsBold);
  R.Italic = F->Style().Contains(fsItalic);
  R.Underline = F->Style().Contains(fsUnderline);
  R.StrikeOut = F->Style().Contains(fsStrikeOut);
  R.Color = Rgb(Control->Enabled() ? PaintColor(F->Color(), clWindowText).value_or(Rgb(clWindowText)) : clGrayText);
  return R;
}

/// The font icons write with: the framework's default face and size.
detail::TRenderFont IconFont(bool Bold) {
  detail::TRenderFont R;
  R.Family = DefaultFontName;
  R.PixelSize = DefaultFontSize * DefaultPPI / 72.0 + (Bold ? 4 : 0);
  R.Bold = Bold;
  R.Color = Rgb(clWindowText);
  return R;
}

TRect Inflate(const TRect& R, int D) { return Rect(R.Left - D, R.Top - D, R.Right + D, R.Bottom + D); }

/// Where a non-visual component's icon stands, as the design surface places it.
TRect IconRect(TComponent* Component) {
  return New<TKilnIconItem>(Component, nullptr, nullptr)->GetBoundsRect();
}

/// A component as messages name it: its name, or its class name when it has none.
String MessageName(const TComponent* C) {
  if (!C) return "(none)";
  return C->Name().empty() ? C->ClassName() : C->Name();
}

bool IsIconComponent(TComponent* C) { return !dynamic_cast<TControl*>(C); }

//===----------------------------------------------------------------------===//
// Grab handles
//===----------------------------------------------------------------------===//

// The handle geometry of the Kiln design surface: squares of `KilnHandleSize` centred on
// the corners and the middles of the sides, clockwise from the top left.
std::vector<TPoint> HandleCentres(const TRect& B) {
  int MX = B.Left + B.Width() / 2, MY = B.Top + B.Height() / 2;
  return {{B.Left, B.Top},     {MX, B.Top},    {B.Right, B.Top}, {B.Right, MY},
          {B.Right, B.Bottom}, {MX, B.Bottom}, {B.Left, B.Bottom}, {B.Left, MY}};
}
TRect HandleRect(TPoint C) {
  return Bounds(C.X - KilnHandleSize / 2, C.Y - KilnHandleSize / 2, KilnHandleSize, KilnHandleSize);
}

//===----------------------------------------------------------------------===//
// The painter
//===----------------------------------------------------------------------===//

/// Draws one root; remembers which unnamed components it has numbered.
class TFormPainter {
public:
  TFormPainter(detail::TRenderCanvas& Canvas, TComponent* Root) : FCanvas(Canvas), FRoot(Root) {}
  void PaintRoot(TPoint Size);
  void PaintHandles(const std::vector<TComponent*>& Selection, TPoint Size);

private:
  String IdOf(TComponent* C);
  void PaintChildren(TWinControl* Parent, TPoint Offset);
  void PaintControl(TControl* Control, TPoint Offset);
  void PaintKind(TControl* Control);
  void PaintIcon(TComponent* Component);
  // Kinds ---------------------------------------------------------------------
  void PaintButton(TButton* Button);
  void PaintLabel(TLabel* Label);
  void PaintEdit(TEdit* Edit);
  void PaintCheckBox(TCheckBox* Box);
  void PaintPanel(TPanel* Panel);
  void PaintStatusBar(TStatusBar* Bar);
  void PaintPlain(TControl* Control);
  // Pieces --------------------------------------------------------------------
  void Fill(const TRect& R, TColor Color, TColor Default);
  void FrameRect(const TRect& R, TColor Color);
  /// Draws `Width` one-pixel edges inside `R`, light or dark on the top and left, and
  /// narrows `R` past them.
  void Bevel(TRect& R, TColor TopLeft, TColor BottomRight, int Width);
  /// One line of text, vertically centred in `Box`; horizontally centred or at its left.
  void TextIn(const TRect& Box, const String& Line, const detail::TRenderFont& Font, bool Centre);

  detail::TRenderCanvas& FCanvas;
  TComponent* FRoot;
  int FUnnamed = 0;
};

String TFormPainter::IdOf(TComponent* C) {
  if (C->Name().empty()) return C->ClassName() + "-" + std::to_string(++FUnnamed);
  // A component of a nested frame is named within the frame.
  if (C != FRoot && C->Owner() && C->Owner() != FRoot) return IdOf(C->Owner()) + "." + C->Name();
  return C->Name();
}

void TFormPainter::PaintRoot(TPoint Size) {
  FCanvas.BeginElement(IdOf(FRoot), FRoot->ClassName(), Rect(0, 0, Size.X, Size.Y), true);
  if (auto* Win = dynamic_cast<TWinControl*>(FRoot)) {
    Fill(Rect(0, 0, Size.X, Size.Y), Win->Color(), clBtnFace);
    PaintChildren(Win, {0, 0});
  } else {
    FCanvas.FillRect(Rect(0, 0, Size.X, Size.Y), Rgb(clWindow));
  }
  // The icons lie above the controls, as on the design surface.
  for (int I = 0; I < FRoot->ComponentCount(); ++I)
    if (TComponent* C = FRoot->Components(I); IsIconComponent(C)) PaintIcon(C);
  FCanvas.EndElement();
}

void TFormPainter::PaintChildren(TWinControl* Parent, TPoint Offset) {
  // Z-order: the last child is drawn last, on top.
  for (int I = 0; I < Parent->ControlCount(); ++I) PaintControl(Parent->Controls(I), Offset);
}

void TFormPainter::PaintControl(TControl* Control, TPoint Offset) {
  // On a design surface every control shows, whatever its Visible says.
  if (Control->ControlStyle().Contains(csNoDesignVisible)) return;
  TRect B = Control->BoundsRect();
  B.Offset(Offset.X, Offset.Y);
  FCanvas.BeginElement(IdOf(Control), Control->ClassName(), B, true);
  PaintKind(Control);
  if (auto* Win = dynamic_cast<TWinControl*>(Control)) PaintChildren(Win, Win->ClientOffset());
  FCanvas.EndElement();
}

void TFormPainter::PaintKind(TControl* Control) {
  if (auto* Button = dynamic_cast<TButton*>(Control)) return PaintButton(Button);
  if (auto* Label = dynamic_cast<TLabel*>(Control)) return PaintLabel(Label);
  if (auto* Edit = dynamic_cast<TEdit*>(Control)) return PaintEdit(Edit);
  if (auto* Box = dynamic_cast<TCheckBox*>(Control)) return PaintCheckBox(Box);
  if (auto* Panel = dynamic_cast<TPanel*>(Control)) return PaintPanel(Panel);
  if (auto* Bar = dynamic_cast<TStatusBar*>(Control)) return PaintStatusBar(Bar);
  if (dynamic_cast<TCustomFrame*>(Control) || dynamic_cast<TCustomForm*>(Control))
    return Fill(Rect(0, 0, Control->Width(), Control->Height()), Control->Color(), clBtnFace);
  PaintPlain(Control);
}

void TFormPainter::PaintIcon(TComponent* Component) {
  TRect B = IconRect(Component);
  FCanvas.BeginElement(IdOf(Component), Component->ClassName(), B, false);
  TRect R = Rect(0, 0, B.Width(), B.Height());
  FCanvas.FillRect(R, Rgb(clBtnFace));
  FrameRect(R, clWindowFrame);
  R = Inflate(R, -1);
  Bevel(R, clBtnHighlight, clBtnShadow, 1);
  // The glyph: the class's first letter after its prefix.
  String Class = Component->ClassName();
  String Glyph = Class.size() > 1 && Class[0] == 'T' ? Class.substr(1, 1) : Class.substr(0, 1);
  TextIn(Rect(0, 0, B.Width(), B.Height()), Glyph, IconFont(true), true);
  detail::TRenderFont Font = IconFont(false);
  TextIn(Rect(-B.Width(), B.Height(), 2 * B.Width(), B.Height() + IconCaptionRoom - 4), Component->Name(), Font, true);
  FCanvas.EndElement();
}

void TFormPainter::PaintHandles(const std::vector<TComponent*>& Selection, TPoint Size) {
  // One selected component has the surface's active handles, filled; of several, each is
  // marked with framed ones.
  bool Active = Selection.size() == 1;
  for (TComponent* C : Selection) {
    TRect B;
    if (C == FRoot) {
      B = Rect(0, 0, Size.X, Size.Y);
    } else if (auto* Control = dynamic_cast<TControl*>(C)) {
      auto* RootControl = dynamic_cast<TWinControl*>(FRoot);
      if (!RootControl || !Control->Parent() || !Control->HasAncestor(RootControl)) continue; // not drawn
      TPoint O = Control->Parent()->ClientToParent({0, 0}, RootControl);
      B = Control->BoundsRect();
      B.Offset(O.X, O.Y);
    } else {
      B = IconRect(C);
    }
    for (TPoint P : HandleCentres(B)) {
      if (Active) FCanvas.FillRect(HandleRect(P), Rgb(RenderHandleColor));
      else FrameRect(HandleRect(P), RenderHandleColor);
    }
  }
}

//===----------------------------------------------------------------------===//
// Kinds
//===----------------------------------------------------------------------===//

void TFormPainter::PaintButton(TButton* Button) {
  TRect R = Rect(0, 0, Button->Width(), Button->Height());
  Fill(R, Button->Color(), clBtnFace);
  TRect Face = R;
  Bevel(Face, clWindowFrame, clWindowFrame, Button->Default() ? 2 : 1);
  Bevel(Face, clBtnHighlight, clBtnShadow, 1);
  TextIn(R, Button->Caption(), FontOf(Button), true);
}

void TFormPainter::PaintLabel(TLabel* Label) {
  TRect R = Rect(0, 0, Label->Width(), Label->Height());
  if (!Label->Transparent()) Fill(R, Label->Color(), clBtnFace);
  detail::TRenderFont Font = FontOf(Label);
  // As the framework paints it: the caption from the top-left corner.
  FCanvas.Text(0, FCanvas.Measure(Label->Caption(), Font).Ascent, Label->Caption(), Font);
}

void TFormPainter::PaintEdit(TEdit* Edit) {
  TRect R = Rect(0, 0, Edit->Width(), Edit->Height());
  Fill(R, Edit->Color(), clWindow);
  Bevel(R, clBtnShadow, clBtnHighlight, 1);
  Bevel(R, clWindowFrame, clBtnFace, 1);
  TextIn(Rect(R.Left + 2, R.Top, R.Right, R.Bottom), Edit->Text(), FontOf(Edit), false);
}

void TFormPainter::PaintCheckBox(TCheckBox* Box) {
  TRect R = Rect(0, 0, Box->Width(), Box->Height());
  Fill(R, Box->Color(), clBtnFace);
  TRect Mark = Bounds(0, (R.Height() - CheckBoxSize) / 2, CheckBoxSize, CheckBoxSize);
  FCanvas.FillRect(Mark, Rgb(Box->Enabled() ? clWindow : clBtnFace));
  FrameRect(Mark, clWindowFrame);
  detail::TRenderFont Font = FontOf(Box);
  if (Box->State() == cbChecked) {
    double X = Mark.Left, Y = Mark.Top;
    FCanvas.Polyline({{X + 3, Y + 6.5}, {X + 5.5, Y + 9}, {X + 10, Y + 3.5}}, Font.Color, 2);
  } else if (Box->State() == cbGrayed) {
    FCanvas.FillRect(Inflate(Mark, -3), Rgb(clBtnShadow));
  }
  TextIn(Rect(CheckBoxSize + 4, 0, R.Right, R.Bottom), Box->Caption(), Font, false);
}

void TFormPainter::PaintPanel(TPanel* Panel) {
  TRect R = Panel->ClientRect();
  Fill(R, Panel->Color(), clBtnFace);
  auto Cut = [&](TBevelCut Kind) {
    if (Kind == bvRaised) Bevel(R, clBtnHighlight, clBtnShadow, Panel->BevelWidth());
    else if (Kind == bvLowered) Bevel(R, clBtnShadow, clBtnHighlight, Panel->BevelWidth());
    else if (Kind == bvSpace) R = Inflate(R, -Panel->BevelWidth());
  };
  Cut(Panel->BevelOuter());
  R = Inflate(R, -Panel->BorderWidth());
  Cut(Panel->BevelInner());
  TextIn(Panel->ClientRect(), Panel->Caption(), FontOf(Panel), true);
}

void TFormPainter::PaintStatusBar(TStatusBar* Bar) {
  TRect R = Bar->ClientRect();
  Fill(R, Bar->Color(), clBtnFace);
  detail::TRenderFont Font = FontOf(Bar);
  if (Bar->SimplePanel()) return TextIn(Rect(R.Left + 2, R.Top, R.Right, R.Bottom), Bar->SimpleText(), Font, false);
  // The cells as the framework lays them out: the last one takes what is left.
  int Left = R.Left;
  int Count = Bar->Panels()->Count();
  for (int I = 0; I < Count; ++I) {
    TStatusPanel* Panel = Bar->Panels()->Items(I);
    bool Last = I == Count - 1;
    TRect Cell = Rect(Left, R.Top, Last ? std::max(R.Right, Left) : Left + Panel->Width(), R.Bottom);
    TextIn(Rect(Cell.Left + 2, Cell.Top, Cell.Right, Cell.Bottom), Panel->Text(), Font, false);
    if (!Last) FCanvas.FillRect(Rect(Cell.Right, R.Top, Cell.Right + 1, R.Bottom), Rgb(clBtnShadow));
    Left = Cell.Right + 1;
  }
}

void TFormPainter::PaintPlain(TControl* Control) {
  TRect R = Rect(0, 0, Control->Width(), Control->Height());
  Fill(R, Control->Color(), clBtnFace);
  FrameRect(R, clBtnShadow);
  TextIn(R, Control->Caption(), FontOf(Control), true);
}

//===----------------------------------------------------------------------===//
// Pieces
//===----------------------------------------------------------------------===//

void TFormPainter::Fill(const TRect& R, TColor Color, TColor Default) {
  if (auto C = PaintColor(Color, Default)) FCanvas.FillRect(R, *C);
}

void TFormPainter::FrameRect(const TRect& R, TColor Color) {
  TRect Inner = R;
  Bevel(Inner, Color, Color, 1);
}

void TFormPainter::Bevel(TRect& R, TColor TopLeft, TColor BottomRight, int Width) {
  std::int32_t Light = Rgb(TopLeft), Dark = Rgb(BottomRight);
  for (int I = 0; I < Width && !R.IsEmpty(); ++I) {
    FCanvas.FillRect(Rect(R.Left, R.Top, R.Right - 1, R.Top + 1), Light);
    FCanvas.FillRect(Rect(R.Left, R.Top, R.Left + 1, R.Bottom - 1), Light);
    FCanvas.FillRect(Rect(R.Left, R.Bottom - 1, R.Right, R.Bottom), Dark);
    FCanvas.FillRect(Rect(R.Right - 1, R.Top, R.Right, R.Bottom), Dark);
    R = Inflate(R, -1);
  }
}

void TFormPainter::TextIn(const TRect& Box, const String& Line, const detail::TRenderFont& Font, bool Centre) {
  if (Line.empty()) return;
  detail::TTextMetrics M = FCanvas.Measure(Line, Font);
  double X = Centre ? Box.Left + (Box.Width() - M.Width) / 2 : Box.Left;
  double Baseline = Box.Top + (Box.Height() - (M.Ascent + M.Descent)) / 2 + M.Ascent;
  FCanvas.Text(X, Baseline, Line, Font);
}

} // namespace

//===----------------------------------------------------------------------===//
// Entry points
//===----------------------------------------------------------------------===//

TPoint RenderSize(TComponent* Root) {
  TPoint Size;
  if (auto* Form = dynamic_cast<TCustomForm*>(Root)) {
    Size = {Form->ClientWidth(), Form->ClientHeight()};
  } else if (auto* Frame = dynamic_cast<TCustomFrame*>(Root)) {
    Size = {Frame->Width(), Frame->Height()};
  } else if (auto* Module = dynamic_cast<TDataModule*>(Root)) {
    Size = Module->DesignSize();
    if (Size.X <= 0 || Size.Y <= 0) {
      // Never sized by a design window: room for the icons and their names.
      Size = {0, 0};
      for (int I = 0; I < Module->ComponentCount(); ++I) {
        TRect R = IconRect(Module->Components(I));
        Size = {std::max(Size.X, R.Right + IconMargin), std::max(Size.Y, R.Bottom + IconCaptionRoom)};
      }
    }
  } else {
    throw ERenderError(sRenderNotARoot, MessageName(Root));
  }
  if (Size.X <= 0 || Size.Y <= 0) throw ERenderError(sRenderNoArea, MessageName(Root), Size.X, Size.Y);
  return Size;
}

namespace detail {

void CheckSelection(TComponent* Root, const std::vector<TComponent*>& Selection) {
  for (TComponent* C : Selection)
    if (!C || (C != Root && C->Owner() != Root))
      throw ERenderError(sRenderNotInRoot, MessageName(C), MessageName(Root));
}

void PaintForm(TRenderCanvas& Canvas, TComponent* Root, const std::vector<TComponent*>& Selection, TPoint Size) {
  TFormPainter Painter(Canvas, Root);
  Painter.PaintRoot(Size);
  Painter.PaintHandles(Selection, Size);
}

} // namespace detail

} // namespace formkit
