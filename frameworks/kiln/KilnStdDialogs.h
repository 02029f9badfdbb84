//===- frameworks/kiln/KilnStdDialogs.h - Colour, font and open dialogs ---===//
//
// The colour, font and open dialogs of the platform, headless like the message
// dialogs: each `Execute` takes the next answer of the dialog script. The
// dialog is recorded with its kind ("ColorDialog", "FontDialog", "OpenDialog"),
// its settings as
// "Name=Value" prompts ("HelpContext=25010", "Options=[cdShowHelp]") and the
// values it opened with; an answer of `mrOk` with values is what a user chose,
// in the same order as those values.
//
// Example:
//   DialogScript().Answer(mrOk, {"clRed"});
//   TObjectGuard<TColorDialog> D(CreateComponentOf<TColorDialog>(nullptr));
//   if (D->Execute()) Shape->SetColor(D->Color());    // clRed
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnExtDlgs.h"
#include "platform/Lists.h"

namespace formkit {

/// The type record of modal results, so that editors can be registered for them.
FK_SUBRANGE(TModalResult, std::int32_t, INT32_MIN, INT32_MAX)

FK_ENUM(TColorDialogOption, std::uint8_t, cdFullOpen, cdPreventFullOpen, cdShowHelp, cdSolidColor, cdAnyColor)
FK_SET(TColorDialogOptions, TColorDialogOption)
FK_ENUM(TFontDialogOption, std::uint8_t, fdAnsiOnly, fdEffects, fdFixedPitchOnly, fdForceFontExist, fdNoSizeSel,
        fdNoStyleSel, fdShowHelp)
FK_SET(TFontDialogOptions, TFontDialogOption)

//===----------------------------------------------------------------------===//
// TCommonDialog
//===----------------------------------------------------------------------===//

/// A dialog as a component: settings, `Execute`, and the result.
class FK_API TCommonDialog : public TComponent {
  FK_CLASS(TCommonDialog, TComponent)

  int HelpContext() const noexcept { return FHelpContext; }
  void SetHelpContext(int Value) noexcept { FHelpContext = Value; }
  /// Shows the dialog; true when it closed with OK, and then the result is taken over.
  /// Raises what the script raises for a dialog without an answer, and the conversion
  /// error of a chosen value that is not valid; then nothing has changed.
  bool Execute();

protected:
  /// The record's kind, settings and the values the dialog opens with.
  virtual TShownDialog Describe() = 0;
  /// Takes over what the user chose, in the order of `Describe`'s values; checks
  /// everything before changing anything.
  virtual void Accept(const std::vector<String>& Values) = 0;

private:
  int FHelpContext = 0;
};

//===----------------------------------------------------------------------===//
// Dialogs
//===----------------------------------------------------------------------===//

/// Chooses a colour; keeps the user's custom colours as "ColorA=RRGGBB" lines.
class FK_API TColorDialog : public TCommonDialog {
  FK_CLASS(TColorDialog, TCommonDialog)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  TColor Color() const noexcept { return FColor; }
  void SetColor(TColor Value) noexcept { FColor = Value; }
  TColorDialogOptions Options() const noexcept { return FOptions; }
  void SetOptions(TColorDialogOptions Value) noexcept { FOptions = Value; }
  /// The custom colours, "Name=Value" lines; owned by the dialog.
  TStrings* CustomColors() const noexcept { return FCustomColors.Get(); }

protected:
  /// Values: the colour, then the custom colour lines. An answer of one value keeps the
  /// custom colours; more replace them.
  TShownDialog Describe() override;
  void Accept(const std::vector<String>& Values) override;

private:
  TColor FColor = clBlack;
  TColorDialogOptions FOptions;
  TObjectGuard<TStrings> FCustomColors;
};

/// Chooses a font: values are the face, the size and the colour.
class FK_API TFontDialog : public TCommonDialog {
  FK_CLASS(TFontDialog, TCommonDialog)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The dialog's own font.
  TFont* Font() const noexcept { return FFont.Get(); }
  /// Copies `Value` into the dialog's font.
  void SetFont(TFont* Value) { FFont->Assign(Value); }
  TFontDialogOptions Options() const noexcept { return FOptions; }
  void SetOptions(TFontDialogOptions Value) noexcept { FOptions = Value; }

protected:
  TShownDialog Describe() override;
  /// Raises `EInvalidOperation` "Font %s does not exist" for a face the screen lacks
  /// under `fdForceFontExist`.
  void Accept(const std::vector<String>& Values) override;

private:
  TObjectGuard<TFont> FFont;
  TFontDialogOptions FOptions;
};

/// Chooses a file to open: the value is the file name. Shares the options of the
/// picture dialogs.
class FK_API TOpenDialog : public TCommonDialog {
  FK_CLASS(TOpenDialog, TCommonDialog)

  const String& FileName() const noexcept { return FFileName; }
  void SetFileName(const String& Value) { FFileName = Value; }
  /// "Description|Pattern" pairs joined by "|".
  const String& Filter() const noexcept { return FFilter; }
  void SetFilter(const String& Value) { FFilter = Value; }
  TOpenOptions Options() const noexcept { return FOptions; }
  void SetOptions(TOpenOptions Value) noexcept { FOptions = Value; }

protected:
  TShownDialog Describe() override;
  /// Raises `EInvalidOperation` "Path %s does not exist" under `ofPathMustExist` and
  /// "File %s does not exist" under `ofFileMustExist` when the file system disagrees.
  void Accept(const std::vector<String>& Values) override;

private:
  String FFileName;
  String FFilter;
  TOpenOptions FOptions;
};

FK_RESOURCESTRING(SFontDoesNotExist, "Font %s does not exist");
FK_RESOURCESTRING(SFileDoesNotExist, "File %s does not exist");
FK_RESOURCESTRING(SPathDoesNotExist, "Path %s does not exist");

} // namespace formkit
