//===- frameworks/kiln/design/KilnMiscEditors.cpp - Cursors, shortcuts, results, files ===//
#include "frameworks/kiln/design/KilnEditors.h"

#include "core/DesignCore.h"
#include "core/DesignIntfClasses.h"
#include "frameworks/kiln/KilnCursors.h"
#include "frameworks/kiln/KilnFonts.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnMenus.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "frameworks/kiln/KilnStdDialogs.h"
#include "frameworks/kiln/KilnWindows.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TCursorProperty, "KilnEditors") {}
FK_IMPLEMENT(TShortCutProperty, "KilnEditors") {}
FK_IMPLEMENT(TModalResultProperty, "KilnEditors") {}
FK_IMPLEMENT(TFileNameProperty, "KilnEditors") {}
FK_IMPLEMENT(TMPFilenameProperty, "KilnEditors") {}
FK_IMPLEMENT(TTabOrderProperty, "KilnEditors") {}
FK_IMPLEMENT(TCaptionProperty, "KilnEditors") {}

//===----------------------------------------------------------------------===//
// Cursors
//===----------------------------------------------------------------------===//

namespace {

/// Scales a length at 96 pixels per inch to the pixels per inch of the active form.
int ScaleToCurrentForm(int Value) {
  TCustomForm* Form = Screen()->ActiveForm();
  return MulDiv(Value, Form ? Form->CurrentPPI() : Screen()->PixelsPerInch(), DefaultPPI);
}

} // namespace

TPropertyAttributes TCursorProperty::GetAttributes() {
  return {paMultiSelect, paSortList, paValueList, paRevertable};
}

String TCursorProperty::GetValue() { return CursorToString(static_cast<TCursor>(GetOrdValue())); }

void TCursorProperty::GetValues(const TGetStrProc& Proc) { GetCursorValues(Proc); }

void TCursorProperty::SetValue(const String& Value) {
  int Cursor = 0;
  if (IdentToCursor(Value, Cursor)) SetOrdValue(Cursor);
  else inherited::SetValue(Value);
}

void TCursorProperty::ListMeasureWidth(const String&, TCanvas*, int& AWidth) { AWidth += ScaleToCurrentForm(36); }

void TCursorProperty::ListMeasureHeight(const String&, TCanvas* ACanvas, int& AHeight) {
  AHeight = std::max(ACanvas->TextHeight("Wg"), ScaleToCurrentForm(36));
}

void TCursorProperty::ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) {
  const int TextLeft = ARect.Left + ScaleToCurrentForm(36);
  int Cursor = 0;
  if (!IdentToCursor(Value, Cursor)) Cursor = StrToInt(Value);
  ACanvas->FillRect(ARect);
  if (ScreenCursors().Contains(Cursor)) {
    TObjectGuard<TBitmap> Picture(new TBitmap);
    Picture->SetSize(PlatformCursorSize, PlatformCursorSize);
    Picture->Canvas()->Brush()->SetColor(ASelected ? clHighlight : clWindow);
    Picture->Canvas()->FillRect(Rect(0, 0, PlatformCursorSize, PlatformCursorSize));
    Picture->Canvas()->Draw(0, 0, ScreenCursors().PictureName(Cursor));
    // The picture scaled to a side of 32 pixels at the form's resolution.
    const int Side = ScaleToCurrentForm(32);
    ACanvas->Draw(ARect.Left + ScaleToCurrentForm(2) + PropertyDrawingOffset, ARect.Top + ScaleToCurrentForm(2),
                  Format("%s %dx%d", ScreenCursors().PictureName(Cursor), Side, Side));
  }
  DefaultPropertyListDrawValue(Value, ACanvas, Rect(TextLeft, ARect.Top, ARect.Right, ARect.Bottom), ASelected,
                               PropertyDrawingOffset);
}

//===----------------------------------------------------------------------===//
// Shortcuts
//===----------------------------------------------------------------------===//

namespace {

std::vector<TShortCut> OfferedShortCuts() {
  std::vector<TShortCut> List;
  for (TShortCut Mods : {scCtrl, TShortCut(scCtrl | scShift)})
    for (TShortCut Key = 'A'; Key <= 'Z'; ++Key) List.push_back(Mods | Key);
  for (TShortCut Mods : {scNone, scCtrl, scShift, TShortCut(scShift | scCtrl)})
    for (TShortCut Key = vkF1; Key <= vkF12; ++Key) List.push_back(Mods | Key);
  for (TShortCut Key : {vkInsert, vkDelete})
    for (TShortCut Mods : {scNone, scShift, scCtrl}) List.push_back(Mods | Key);
  List.push_back(scAlt | vkBack);
  List.push_back(scShift | scAlt | vkBack);
  return List;
}

} // namespace

TPropertyAttributes TShortCutProperty::GetAttributes() { return {paMultiSelect, paValueList, paRevertable}; }

String TShortCutProperty::GetValue() {
  auto Value = static_cast<TShortCut>(GetOrdValue());
  return Value == scNone ? LoadResString(srNone) : ShortCutToText(Value);
}

void TShortCutProperty::GetValues(const TGetStrProc& Proc) {
  Proc(LoadResString(srNone));
  static const std::vector<TShortCut> Offered = OfferedShortCuts();
  for (TShortCut S : Offered) Proc(ShortCutToText(S));
}

void TShortCutProperty::SetValue(const String& Value) {
  TShortCut NewValue = scNone;
  if (!Value.empty() && !SameText(Value, LoadResString(srNone))) {
    NewValue = TextToShortCut(Value);
    if (NewValue == scNone) throw EDesignPropertyError(SInvalidPropertyValue);
  }
  SetOrdValue(NewValue);
}

//===----------------------------------------------------------------------===//
// Modal results
//===----------------------------------------------------------------------===//

const std::vector<String>& ModalResultNames() {
  static const std::vector<String> Names = {"mrNone",  "mrOk",   "mrCancel",   "mrAbort",    "mrRetry",
                                            "mrIgnore", "mrYes",  "mrNo",       "mrClose",    "mrHelp",
                                            "mrTryAgain", "mrContinue", "mrAll", "mrNoToAll", "mrYesToAll"};
  return Names;
}

TPropertyAttributes TModalResultProperty::GetAttributes() { return {paMultiSelect, paValueList, paRevertable}; }

String TModalResultProperty::GetValue() {
  std::int32_t Value = GetOrdValue();
  const auto& Names = ModalResultNames();
  return Value >= 0 && Value < static_cast<std::int32_t>(Names.size()) ? Names[static_cast<size_t>(Value)]
                                                                        : IntToStr(Value);
}

void TModalResultProperty::GetValues(const TGetStrProc& Proc) {
  for (const String& Name : ModalResultNames()) Proc(Name);
}

void TModalResultProperty::SetValue(const String& Value) {
  if (Value.empty()) {
    SetOrdValue(0);
    return;
  }
  const auto& Names = ModalResultNames();
  auto It = std::find_if(Names.begin(), Names.end(), [&](const String& N) { return CompareText(N, Value) == 0; });
  if (It != Names.end()) SetOrdValue(static_cast<std::int32_t>(It - Names.begin()));
  else inherited::SetValue(Value);
}

//===----------------------------------------------------------------------===//
// File names, tab orders, captions
//===----------------------------------------------------------------------===//

TPropertyAttributes TFileNameProperty::GetAttributes() { return {paDialog, paRevertable, paMultiSelect}; }

void TFileNameProperty::Edit() {
  TObjectGuard<TOpenDialog> Dialog(CreateComponentOf<TOpenDialog>(nullptr));
  GetDialogOptions(Dialog.Get());
  if (Dialog->Execute()) SetValue(Dialog->FileName());
}

void TFileNameProperty::GetDialogOptions(TOpenDialog* Dialog) {
  Dialog->SetFilter(LoadResString(SAllFiles));
  Dialog->SetOptions(Dialog->Options() + TOpenOptions{ofFileMustExist});
}

TPropertyAttributes TMPFilenameProperty::GetAttributes() { return {paDialog, paRevertable}; }

void TMPFilenameProperty::Edit() {
  TObjectGuard<TOpenDialog> Dialog(CreateComponentOf<TOpenDialog>(Application()));
  Dialog->SetFileName(GetValue());
  Dialog->SetFilter(LoadResString(SMPOpenFilter));
  Dialog->SetHelpContext(MediaFileDialogHelpContext);
  Dialog->SetOptions(Dialog->Options() + TOpenOptions{ofShowHelp, ofPathMustExist, ofFileMustExist});
  if (Dialog->Execute()) SetValue(Dialog->FileName());
}

TPropertyAttributes TCaptionProperty::GetAttributes() { return {paMultiSelect, paAutoUpdate, paRevertable}; }

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

void RegisterKilnEditors() {
  // The unit's finalisation: when the core stops, the registry key goes with it.
  static const bool StepAdded = [] {
    AddDesignCoreStep(TCoreStage::DefaultRegistrations, "KilnEditors", nullptr, &UnregisterKilnEditors);
    return true;
  }();
  (void)StepAdded;
  RegisterPropertyEditor(TypeInfo_TColor(), nullptr, "", TColorProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TCursor(), nullptr, "", TCursorProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TFontName(), nullptr, "", TFontNameProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<String>(), TFont::StaticClass(), "Name", TFontNameProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TFontCharset(), nullptr, "", TFontCharsetProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TImeName(), nullptr, "", TImeNameProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<TFont*>(), nullptr, "", TFontProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<TBrushStyle>(), nullptr, "", TBrushStyleProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<TPenStyle>(), nullptr, "", TPenStyleProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TShortCut(), nullptr, "", TShortCutProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TModalResult(), nullptr, "", TModalResultProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<int>(), TButton::StaticClass(), "ModalResult", TModalResultProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TTabOrder(), nullptr, "", TTabOrderProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TCaption(), nullptr, "", TCaptionProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<bool>(), nullptr, "", TBooleanProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<TFontStyles>(), nullptr, "", KilnEditors::TSetProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo<TOpenOptions>(), nullptr, "", KilnEditors::TSetProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TDate(), nullptr, "", KilnEditors::TDateProperty::StaticClass());
}

} // namespace formkit
