//===- frameworks/kiln/KilnExtDlgs.cpp - File dialogs of pictures ---------===//
#include "frameworks/kiln/KilnExtDlgs.h"

#include "frameworks/kiln/KilnPictures.h"

#include <sys/stat.h>

namespace formkit {

namespace {

bool IsFile(const String& Name) {
  struct stat Info {};
  return ::stat(Name.c_str(), &Info) == 0 && S_ISREG(Info.st_mode);
}

} // namespace

FK_IMPLEMENT(TPictureFileDialog, "KilnExtDlgs") {
  B.Property("DefaultExt", &TPictureFileDialog::DefaultExt, &TPictureFileDialog::SetDefaultExt);
  B.Property("FileName", &TPictureFileDialog::FileName, &TPictureFileDialog::SetFileName);
  B.Property("Filter", &TPictureFileDialog::Filter, &TPictureFileDialog::SetFilter);
  B.Property("HelpContext", &TPictureFileDialog::HelpContext, &TPictureFileDialog::SetHelpContext).Default(0);
  B.Property("Options", &TPictureFileDialog::Options, &TPictureFileDialog::SetOptions);
  B.Property("Title", &TPictureFileDialog::Title, &TPictureFileDialog::SetTitle);
}

void TPictureFileDialog::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FFilter = GraphicFilter(TGraphic::StaticClass());
}

bool TPictureFileDialog::Execute() {
  for (;;) {
    TShownDialog Shown;
    Shown.Kind = DialogKind();
    Shown.Caption = FTitle;
    Shown.Message = FFilter;
    Shown.Values = {FFileName};
    auto [Result, Values] = DialogScript().Take(std::move(Shown));
    if (Result != mrOk || Values.empty() || Values.front().empty()) return false;
    String Name = Values.front();
    if (!FDefaultExt.empty() && ExtractFileExt(Name).empty()) Name += "." + FDefaultExt;
    if (Opens() && FOptions.Contains(ofFileMustExist) && !IsFile(Name)) continue;
    FFileName = Name;
    return true;
  }
}

FK_IMPLEMENT(TOpenPictureDialog, "KilnExtDlgs") {}
FK_IMPLEMENT(TSavePictureDialog, "KilnExtDlgs") {}

} // namespace formkit
