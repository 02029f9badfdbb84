//===- frameworks/kiln/KilnStdDialogs.cpp - Colour, font and open dialogs -===//
#include "frameworks/kiln/KilnStdDialogs.h"

#include "frameworks/kiln/KilnFonts.h"

#include <algorithm>
#include <sys/stat.h>

namespace formkit {

FK_IMPLEMENT(TCommonDialog, "KilnStdDialogs") {}
FK_IMPLEMENT(TColorDialog, "KilnStdDialogs") {}
FK_IMPLEMENT(TFontDialog, "KilnStdDialogs") {}
FK_IMPLEMENT(TOpenDialog, "KilnStdDialogs") {}

namespace {

template <class S> String Setting(const char* Name, S Value) {
  return Format("%s=%s", Name, SetToString(TypeInfo<S>(), Value.Mask()));
}

bool PathExists(const String& Path, bool Directory) {
  struct stat Info {};
  return ::stat(Path.c_str(), &Info) == 0 && (Directory ? S_ISDIR(Info.st_mode) : S_ISREG(Info.st_mode));
}

} // namespace

bool TCommonDialog::Execute() {
  TShownDialog Dialog = Describe();
  Dialog.Prompts.insert(Dialog.Prompts.begin(), Format("HelpContext=%d", FHelpContext));
  auto [Result, Values] = DialogScript().Take(std::move(Dialog));
  if (Result != mrOk) return false;
  if (!Values.empty()) Accept(Values);
  return true;
}

//===----------------------------------------------------------------------===//
// TColorDialog
//===----------------------------------------------------------------------===//

void TColorDialog::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FCustomColors.Reset(new TStringList);
}

void TColorDialog::BeforeDestruction() {
  FCustomColors.Reset();
  inherited::BeforeDestruction();
}

TShownDialog TColorDialog::Describe() {
  TShownDialog D;
  D.Kind = "ColorDialog";
  D.Prompts = {Setting("Options", FOptions)};
  D.Values.push_back(ColorToString(FColor));
  for (int I = 0; I < FCustomColors->Count(); ++I) D.Values.push_back(FCustomColors->Get(I));
  return D;
}

void TColorDialog::Accept(const std::vector<String>& Values) {
  TColor Chosen = StringToColor(Values[0]);
  if (Values.size() > 1) {
    FCustomColors->Clear();
    for (size_t I = 1; I < Values.size(); ++I) FCustomColors->Add(Values[I]);
  }
  FColor = Chosen;
}

//===----------------------------------------------------------------------===//
// TFontDialog
//===----------------------------------------------------------------------===//

void TFontDialog::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FFont.Reset(new TFont);
}

void TFontDialog::BeforeDestruction() {
  FFont.Reset();
  inherited::BeforeDestruction();
}

TShownDialog TFontDialog::Describe() {
  TShownDialog D;
  D.Kind = "FontDialog";
  D.Prompts = {Setting("Options", FOptions)};
  D.Values = {FFont->Name(), IntToStr(FFont->Size()), ColorToString(FFont->Color())};
  return D;
}

void TFontDialog::Accept(const std::vector<String>& Values) {
  const String& Name = Values[0];
  if (FOptions.Contains(fdForceFontExist)) {
    const auto& Fonts = ScreenFonts();
    if (std::none_of(Fonts.begin(), Fonts.end(), [&](const String& F) { return SameText(F, Name); }))
      throw EInvalidOperation(SFontDoesNotExist, Name);
  }
  int Size = Values.size() > 1 ? StrToInt(Values[1]) : FFont->Size();
  TColor Color = Values.size() > 2 ? StringToColor(Values[2]) : FFont->Color();
  TObjectGuard<TFont> Chosen(new TFont);
  Chosen->Assign(FFont.Get());
  Chosen->SetName(Name);
  Chosen->SetSize(Size); // raises for a size below 1, before the dialog's font changes
  Chosen->SetColor(Color);
  FFont->Assign(Chosen.Get());
}

//===----------------------------------------------------------------------===//
// TOpenDialog
//===----------------------------------------------------------------------===//

TShownDialog TOpenDialog::Describe() {
  TShownDialog D;
  D.Kind = "OpenDialog";
  D.Prompts = {"Filter=" + FFilter, Setting("Options", FOptions)};
  D.Values = {FFileName};
  return D;
}

void TOpenDialog::Accept(const std::vector<String>& Values) {
  const String& Name = Values[0];
  if (FOptions.Contains(ofPathMustExist)) {
    size_t Slash = Name.rfind('/');
    String Dir = Slash == String::npos ? String(".") : Slash == 0 ? String("/") : Name.substr(0, Slash);
    if (!PathExists(Dir, true)) throw EInvalidOperation(SPathDoesNotExist, Dir);
  }
  if (FOptions.Contains(ofFileMustExist) && !PathExists(Name, false)) throw EInvalidOperation(SFileDoesNotExist, Name);
  FFileName = Name;
}

} // namespace formkit
