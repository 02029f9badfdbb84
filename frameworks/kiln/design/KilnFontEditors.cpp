//===- frameworks/kiln/design/KilnFontEditors.cpp - Fonts, faces, character sets ===//
#include "frameworks/kiln/design/KilnEditors.h"

#include "frameworks/kiln/KilnFonts.h"
#include "frameworks/kiln/KilnStdDialogs.h"
#include "platform/ScopeGuard.h"

namespace formkit {

FK_IMPLEMENT(TFontNameProperty, "KilnEditors") {}
FK_IMPLEMENT(TFontCharsetProperty, "KilnEditors") {}
FK_IMPLEMENT(TImeNameProperty, "KilnEditors") {}
FK_IMPLEMENT(TFontProperty, "KilnEditors") {}

namespace {
void OfferAll(const std::vector<String>& Names, const TGetStrProc& Proc) {
  for (const String& Name : Names) Proc(Name);
}
} // namespace

//===----------------------------------------------------------------------===//
// Font faces and input methods
//===----------------------------------------------------------------------===//

TPropertyAttributes TFontNameProperty::GetAttributes() {
  return {paMultiSelect, paValueList, paSortList, paRevertable};
}

void TFontNameProperty::GetValues(const TGetStrProc& Proc) { OfferAll(ScreenFonts(), Proc); }

void TFontNameProperty::ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) {
  if (!FontNamePropertyDisplayFontNames) return;
  detail::TSavedCanvasState Saved(ACanvas);
  ACanvas->Font()->SetName(Value);
  AWidth = ACanvas->TextWidth(Value) + 4;
}

void TFontNameProperty::ListMeasureHeight(const String& Value, TCanvas* ACanvas, int& AHeight) {
  if (!FontNamePropertyDisplayFontNames) return;
  detail::TSavedCanvasState Saved(ACanvas);
  ACanvas->Font()->SetName(Value);
  AHeight = ACanvas->TextHeight(Value) + 2;
}

void TFontNameProperty::ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  if (!FontNamePropertyDisplayFontNames) {
    DefaultPropertyListDrawValue(Value, ACanvas, ARect, ASelected, PropertyDrawingOffset);
    return;
  }
  const String OldName = ACanvas->Font()->Name();
  ACanvas->Font()->SetName(Value);
  auto Restore = Finally([&]() noexcept { RunIgnoringExceptions([&] { ACanvas->Font()->SetName(OldName); }); });
  ACanvas->TextRect(ARect, ARect.Left + 2 + PropertyDrawingOffset, ARect.Top + 1, Value);
}

TPropertyAttributes TImeNameProperty::GetAttributes() { return {paValueList, paSortList, paMultiSelect}; }

void TImeNameProperty::GetValues(const TGetStrProc& Proc) { OfferAll(ScreenImes(), Proc); }

//===----------------------------------------------------------------------===//
// Character sets
//===----------------------------------------------------------------------===//

TPropertyAttributes TFontCharsetProperty::GetAttributes() { return {paMultiSelect, paSortList, paValueList}; }

String TFontCharsetProperty::GetValue() {
  std::int32_t Value = GetOrdValue();
  String Name;
  return CharsetToIdent(Value & 0xFF, Name) ? Name : Format("%d", Value);
}

void TFontCharsetProperty::GetValues(const TGetStrProc& Proc) { GetCharsetValues(Proc); }

void TFontCharsetProperty::SetValue(const String& Value) {
  int Charset = 0;
  if (IdentToCharset(Value, Charset)) SetOrdValue(Charset);
  else inherited::SetValue(Value);
}

//===----------------------------------------------------------------------===//
// Fonts
//===----------------------------------------------------------------------===//

TPropertyAttributes TFontProperty::GetAttributes() { return {paMultiSelect, paSubProperties, paDialog, paReadOnly}; }

void TFontProperty::Edit() {
  TObjectGuard<TFontDialog> Dialog(CreateComponentOf<TFontDialog>(nullptr));
  if (auto* Font = dynamic_cast<TFont*>(GetObjectProp(GetComponent(0), GetPropInfo()))) Dialog->SetFont(Font);
  Dialog->SetHelpContext(FontDialogHelpContext);
  Dialog->SetOptions(Dialog->Options() + TFontDialogOptions{fdForceFontExist, fdShowHelp});
  if (!Dialog->Execute()) return;
  // Each object's setter copies the dialog's font into its own.
  WriteAllPairs([&](TPersistent* Instance, PPropInfo Prop) { SetObjectProp(Instance, Prop, Dialog->Font()); });
}

} // namespace formkit
