//===- frameworks/kiln/design/KilnColorEditors.cpp - Colours, brushes, pens ===//
#include "frameworks/kiln/design/KilnEditors.h"

#include "frameworks/kiln/KilnStdDialogs.h"
#include "frameworks/kiln/KilnWindows.h"
#include "platform/Registry.h"

namespace formkit {

FK_IMPLEMENT(TColorProperty, "KilnEditors") {}
FK_IMPLEMENT(TBrushStyleProperty, "KilnEditors") {}
FK_IMPLEMENT(TPenStyleProperty, "KilnEditors") {}

//===----------------------------------------------------------------------===//
// TColorProperty
//===----------------------------------------------------------------------===//

namespace {

/// The colour of a colour name, without regard to case. Numbers are left to the integer
/// parse, which gives their range and number errors.
bool TryStringToColor(const String& Text, TColor& Color) { return IdentToColor(Text, Color); }

/// The colour a listed or shown value stands for: a name or a number; black for neither.
TColor ColorOfText(const String& Text) {
  TColor Color = clBlack;
  if (IdentToColor(Text, Color)) return Color;
  try {
    return StringToColor(Text);
  } catch (const EConvertError&) {
    return clBlack;
  }
}

/// The custom colours kept under `BaseRegistryKey`, as "Name=Value" lines.
void ReadCustomColors(TCustomIniFile& Ini, TStrings* Colors) {
  TObjectGuard<TStringList> Names(new TStringList);
  Ini.ReadSection(LoadResString(SCustomColors), Names.Get());
  for (int I = 0; I < Names->Count(); ++I)
    Colors->Add(Names->Get(I) + "=" + Ini.ReadString(LoadResString(SCustomColors), Names->Get(I), ""));
}

void WriteCustomColors(TCustomIniFile& Ini, TStrings* Colors) {
  for (int I = 0; I < Colors->Count(); ++I) {
    const String Line = Colors->Get(I);
    size_t Eq = Line.find('=');
    if (Eq == String::npos) continue;
    Ini.WriteString(LoadResString(SCustomColors), Line.substr(0, Eq), Line.substr(Eq + 1));
  }
  Ini.UpdateFile();
}

} // namespace

TPropertyAttributes TColorProperty::GetAttributes() {
  return {paMultiSelect, paDialog, paValueList, paRevertable};
}

String TColorProperty::GetValue() { return ColorToString(GetOrdValue()); }

void TColorProperty::GetValues(const TGetStrProc& Proc) { GetColorValues(Proc); }

void TColorProperty::SetValue(const String& Value) {
  TColor Color;
  if (TryStringToColor(Value, Color)) SetOrdValue(Color);
  else inherited::SetValue(Value);
}

void TColorProperty::Edit() {
  TObjectGuard<TColorDialog> Dialog(CreateComponentOf<TColorDialog>(Application()));
  TObjectGuard<TRegistryIniFile> Ini;
  if (!BaseRegistryKey.empty()) {
    // Custom colours are a convenience: a registry that cannot be read leaves them out.
    try {
      Ini.Reset(new TRegistryIniFile(BaseRegistryKey));
      ReadCustomColors(*Ini.Get(), Dialog->CustomColors());
    } catch (const std::exception&) {
      Dialog->CustomColors()->Clear();
    }
  }
  Dialog->SetColor(GetOrdValue());
  Dialog->SetHelpContext(ColorDialogHelpContext);
  Dialog->SetOptions({cdShowHelp});
  if (Dialog->Execute()) SetOrdValue(Dialog->Color());
  if (Ini.Get()) WriteCustomColors(*Ini.Get(), Dialog->CustomColors());
}

TRect TColorProperty::PaintColorBox(const String& Value, TCanvas* ACanvas, const TRect& Rect, bool Selected) {
  const int BoxRight = Rect.Left + Rect.Height() - 4;
  {
    detail::TSavedCanvasState Saved(ACanvas);
    ACanvas->FillRect(Rect);
    TRect Box = formkit::Rect(Rect.Left + 2, Rect.Top + 2, BoxRight + 2, Rect.Bottom - 2);
    ACanvas->Brush()->SetColor(ColorOfText(Value));
    ACanvas->FillRect(Box);
    ACanvas->Brush()->SetColor(Selected ? clHighlightText : clWindowText);
    ACanvas->FrameRect(Box);
  }
  return formkit::Rect(BoxRight + 8, Rect.Top, Rect.Right, Rect.Bottom);
}

void TColorProperty::ListMeasureWidth(const String&, TCanvas* ACanvas, int& AWidth) {
  AWidth += ACanvas->TextHeight("M");
}

void TColorProperty::ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  TRect R = ARect;
  R.Left += PropertyDrawingOffset;
  TRect Rest = PaintColorBox(Value, ACanvas, R, ASelected);
  DefaultPropertyListDrawValue(Value, ACanvas, Rest, ASelected, 0);
}

void TColorProperty::PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawName(this, ACanvas, ARect);
}

void TColorProperty::PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  String Shown = GetVisualValue();
  if (!Shown.empty()) (void)PaintColorBox(Shown, ACanvas, ARect, ASelected);
  else DefaultPropertyDrawValue(this, ACanvas, ARect);
}

TRect TColorProperty::PropDrawValueRect(const TRect& ARect) {
  return Rect(ARect.Left, ARect.Top, ARect.Left + ARect.Bottom - ARect.Top, ARect.Bottom);
}

//===----------------------------------------------------------------------===//
// Brush and pen styles
//===----------------------------------------------------------------------===//

namespace {

/// Wipes the sample area left of `SampleRight` and readies the pen for the sample.
void WipeSample(TCanvas* ACanvas, const TRect& ARect, int SampleRight) {
  ACanvas->Pen()->SetColor(ACanvas->Brush()->Color());
  ACanvas->Brush()->SetColor(clWindow);
  ACanvas->Rectangle(ARect.Left, ARect.Top, SampleRight, ARect.Bottom);
  ACanvas->Pen()->SetColor(clWindowText);
}

} // namespace

void TBrushStyleProperty::ListMeasureWidth(const String&, TCanvas* ACanvas, int& AWidth) {
  AWidth += ACanvas->TextHeight("A");
}

void TBrushStyleProperty::ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  const int SampleRight = ARect.Left + ARect.Height();
  {
    detail::TSavedCanvasState Saved(ACanvas);
    WipeSample(ACanvas, ARect, SampleRight);
    auto Style = static_cast<TBrushStyle>(GetEnumValue(GetPropType(), Value));
    ACanvas->Brush()->SetStyle(Style);
    if (Style == bsClear) {
      ACanvas->Brush()->SetColor(clWindow);
      ACanvas->Brush()->SetStyle(bsSolid);
    } else {
      ACanvas->Brush()->SetColor(clWindowText);
    }
    ACanvas->Rectangle(ARect.Left + 1, ARect.Top + 1, SampleRight - 1, ARect.Bottom - 1);
  }
  DefaultPropertyListDrawValue(Value, ACanvas, Rect(SampleRight, ARect.Top, ARect.Right, ARect.Bottom), ASelected,
                               PropertyDrawingOffset);
}

void TBrushStyleProperty::PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawName(this, ACanvas, ARect);
}

void TBrushStyleProperty::PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawValue(this, ACanvas, ARect);
}

void TPenStyleProperty::GetValues(const TGetStrProc& Proc) {
  const TTypeData* Data = GetTypeData(GetPropType());
  for (std::int64_t V = Data->MinValue; V <= Data->MaxValue && V <= 8; ++V)
    if (V != 7 && V != 8) Proc(GetEnumName(GetPropType(), V));
}

void TPenStyleProperty::ListMeasureWidth(const String&, TCanvas* ACanvas, int& AWidth) {
  AWidth += 2 * ACanvas->TextHeight("X");
}

void TPenStyleProperty::ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  const int SampleRight = ARect.Left + 2 * ARect.Height();
  {
    detail::TSavedCanvasState Saved(ACanvas);
    WipeSample(ACanvas, ARect, SampleRight);
    ACanvas->Brush()->SetColor(clWindow);
    ACanvas->FrameRect(Rect(ARect.Left, ARect.Top, SampleRight, ARect.Bottom));
    ACanvas->Pen()->SetStyle(static_cast<TPenStyle>(GetEnumValue(GetPropType(), Value)));
    const int Middle = (ARect.Top + ARect.Bottom) / 2;
    ACanvas->MoveTo(ARect.Left + 1, Middle);
    ACanvas->LineTo(SampleRight - 1, Middle);
    ACanvas->MoveTo(ARect.Left + 1, Middle + 1);
    ACanvas->LineTo(SampleRight - 1, Middle + 1);
  }
  DefaultPropertyListDrawValue(Value, ACanvas, Rect(SampleRight, ARect.Top, ARect.Right, ARect.Bottom), ASelected,
                               PropertyDrawingOffset);
}

void TPenStyleProperty::PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawName(this, ACanvas, ARect);
}

void TPenStyleProperty::PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool) {
  DefaultPropertyDrawValue(this, ACanvas, ARect);
}

} // namespace formkit
