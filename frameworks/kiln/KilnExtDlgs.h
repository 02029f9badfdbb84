//===- frameworks/kiln/KilnExtDlgs.h - File dialogs of pictures -----------===//
//
// The open and save dialogs of pictures: file dialogs whose filter starts as
// that of every picture format. With no one at the keyboard, `Execute` takes
// the next answer of the dialog script: OK with the file chosen as its first
// value, or Cancel. Each dialog is recorded as "OpenPictureDialog" or
// "SavePictureDialog" with its title as the caption, its filter as the
// message and the file name it offered as its one value.
//
// Example:
//   DialogScript().Answer(mrOk, {"/tmp/logo.png"});
//   TObjectGuard<TOpenPictureDialog> Open(CreateComponentOf<TOpenPictureDialog>(nullptr));
//   if (Open->Execute()) Picture->LoadFromFile(Open->FileName());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDialogs.h"

namespace formkit {

FK_ENUM(TOpenOption, std::uint8_t, ofReadOnly, ofOverwritePrompt, ofHideReadOnly, ofNoChangeDir, ofShowHelp,
        ofNoValidate, ofAllowMultiSelect, ofExtensionDifferent, ofPathMustExist, ofFileMustExist, ofCreatePrompt)
FK_SET(TOpenOptions, TOpenOption)

/// What the two picture dialogs share: title, file name, filter, default extension,
/// options and help context.
class FK_API TPictureFileDialog : public TComponent {
  FK_CLASS(TPictureFileDialog, TComponent)
  void Create(TComponent* AOwner) override;

  const String& Title() const noexcept { return FTitle; }
  void SetTitle(const String& Value) { FTitle = Value; }
  /// The file chosen, or offered before the dialog opens.
  const String& FileName() const noexcept { return FFileName; }
  void SetFileName(const String& Value) { FFileName = Value; }
  /// Pairs "description|masks" joined by "|".
  const String& Filter() const noexcept { return FFilter; }
  void SetFilter(const String& Value) { FFilter = Value; }
  /// The extension, without its dot, added to a name chosen without one.
  const String& DefaultExt() const noexcept { return FDefaultExt; }
  void SetDefaultExt(const String& Value) { FDefaultExt = Value; }
  TOpenOptions Options() const noexcept { return FOptions; }
  void SetOptions(TOpenOptions Value) noexcept { FOptions = Value; }
  int HelpContext() const noexcept { return FHelpContext; }
  void SetHelpContext(int Value) noexcept { FHelpContext = Value; }

  /// Shows the dialog; true when a file was chosen, which `FileName` then holds. When the
  /// file must exist, a name of none keeps the dialog open: the next answer is taken.
  bool Execute();

protected:
  /// The kind recorded in the dialog script.
  virtual const char* DialogKind() const = 0;
  /// Whether `ofFileMustExist` counts: for opening only, so that a new file may be named.
  virtual bool Opens() const noexcept = 0;

private:
  String FTitle, FFileName, FFilter, FDefaultExt;
  TOpenOptions FOptions{ofHideReadOnly};
  int FHelpContext = 0;
};

/// The open dialog of pictures.
class FK_API TOpenPictureDialog : public TPictureFileDialog {
  FK_CLASS(TOpenPictureDialog, TPictureFileDialog)

protected:
  const char* DialogKind() const override { return "OpenPictureDialog"; }
  bool Opens() const noexcept override { return true; }
};

/// The save dialog of pictures.
class FK_API TSavePictureDialog : public TPictureFileDialog {
  FK_CLASS(TSavePictureDialog, TPictureFileDialog)

protected:
  const char* DialogKind() const override { return "SavePictureDialog"; }
  bool Opens() const noexcept override { return false; }
};

} // namespace formkit
