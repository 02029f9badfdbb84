//===- frameworks/kiln/design/PicEdit.h - The picture editor --------------===//
//
// One dialog edits a picture or a graphic: it loads one from a file, saves it,
// clears it and shows it scaled into its preview box. It works on a copy, so
// Cancel leaves the property untouched. `TPictureProperty` opens it for
// picture properties, `TGraphicProperty` for graphic properties (refusing a
// graphic of another class than the property's), and `TGraphicEditor` on a
// double click on a component whose "Picture" or "Image" is its main property.
//
// Example:
//   RegisterPictureEditors();          // in the design package's registration
//   DialogScript().AnswerBy([](TCustomForm& F) {
//     DialogScript().Answer(mrOk, {"logo.png"});   // the open dialog's answer
//     ClickButton(F, "Load");
//     return ClickButton(F, "OKButton");
//   });
//   GetComponentEditor(Image1, Designer)->Edit();  // Image1's picture is logo.png
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ComponentEditors.h"
#include "editors/ScalarEditors.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnExtDlgs.h"
#include "frameworks/kiln/KilnPictures.h"
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit {

FK_RESOURCESTRING(SLoadPictureTitle, "Load Picture");
FK_RESOURCESTRING(SSavePictureTitle, "Save Picture As");
FK_RESOURCESTRING(SInvalidFormat, "Invalid graphic format");
FK_RESOURCESTRING(SPictureNone, "(None)");
/// The filter both file dialogs have until the editor sets its own.
FK_RESOURCESTRING(SPictureDesignFilter,
                  "All (*.bmp;*.ico;*.emf;*.wmf)|*.bmp;*.ico;*.emf;*.wmf|Bitmaps (*.bmp)|*.bmp|Icons (*.ico)|*.ico|"
                  "Enhanced Metafiles (*.emf)|*.emf|Metafiles (*.wmf)|*.wmf");

//===----------------------------------------------------------------------===//
// The dialog
//===----------------------------------------------------------------------===//

/// "Picture Editor": a preview of the working copy `Pic` and the buttons that load,
/// save and clear it. Fixed at 344 by 294 client pixels, centred on the screen.
class FK_API TPictureEditorDlg : public TForm {
  FK_CLASS(TPictureEditorDlg, TForm)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The working copy, owned.
  TPicture* Picture() const noexcept { return Pic.Get(); }

  /// Loads a picture chosen in `OpenDialog` into the copy; a file that cannot be read
  /// raises and leaves the copy as it was.
  void LoadClick(TObject* Sender);
  /// Saves the copy to a file chosen in `SaveDialog`; nothing without a graphic.
  void SaveClick(TObject* Sender);
  /// Empties the copy.
  void ClearClick(TObject* Sender);
  void HelpButtonClick(TObject* Sender);
  /// Draws the copy into the preview: at its size and centred when it fits, else scaled
  /// to the box's width (a wide one, at the top) or height (at the left); "(None)" when
  /// empty.
  void ImagePaintBoxPaint(TObject* Sender);
  void FormShow(TObject* Sender);

  TOpenPictureDialog* OpenDialog = nullptr;
  TSavePictureDialog* SaveDialog = nullptr;
  TButton* OKButton = nullptr;
  TButton* CancelButton = nullptr;
  TButton* HelpButton = nullptr;
  TPanel* GroupBox1 = nullptr;
  TPanel* ImagePanel = nullptr;
  TButton* Load = nullptr;
  TButton* Save = nullptr;
  TButton* Clear = nullptr;
  TPaintBox* ImagePaintBox = nullptr;
  TShape* Shape1 = nullptr;
  TPanel* pnRight = nullptr;
  TPanel* pnBottom = nullptr;

private:
  /// Save and Clear are enabled exactly when the copy has a graphic that is not empty.
  void UpdateButtons();
  TObjectGuard<TPicture> Pic;
};

/// Runs the dialog on a picture: `Execute` shows it on a copy of `Picture` and takes
/// the copy back on OK. Lives for one edit.
class FK_API TPictureEditor : public TComponent {
  FK_CLASS(TPictureEditor, TComponent)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The class the file dialogs offer; `TGraphic` (every format) at first.
  TGraphicClass GraphicClass() const noexcept { return FGraphicClass; }
  void SetGraphicClass(TGraphicClass Value) noexcept { FGraphicClass = Value; }
  /// The picture edited, owned; `SetPicture` copies into it.
  TPicture* Picture() const noexcept { return FPicture.Get(); }
  void SetPicture(TPicture* Value) { FPicture->Assign(Value); }
  /// The dialog, owned as a component of the editor.
  TPictureEditorDlg* Dialog() const noexcept { return FPicDlg; }

  /// Shows the dialog; true when it closed with OK, and then `Picture` holds the result.
  [[nodiscard]] bool Execute();

private:
  TGraphicClass FGraphicClass = nullptr;
  TObjectGuard<TPicture> FPicture;
  TPictureEditorDlg* FPicDlg = nullptr;
};

//===----------------------------------------------------------------------===//
// Property and component editors
//===----------------------------------------------------------------------===//

/// The editor of picture properties: "(TPngImage)" or "(None)", and the dialog.
class FK_API TPictureProperty : public TPropertyEditor {
  FK_CLASS(TPictureProperty, TPropertyEditor)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paDialog}; }
  String GetValue() override;
  /// Empty text clears the picture; any other text is ignored.
  void SetValue(const String& Value) override;
  /// Edits the picture in the dialog and stores the result on OK.
  void Edit() override;
};

/// The editor of graphic properties: the class of the graphic held, or "(None)" for
/// none or an empty one, and the dialog.
class FK_API TGraphicProperty : public TClassProperty {
  FK_CLASS(TGraphicProperty, TClassProperty)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paDialog}; }
  String GetValue() override;
  /// Empty text stores null; any other text is ignored.
  void SetValue(const String& Value) override;
  /// Edits the graphic in the dialog. On OK a graphic of another class than the
  /// property's raises `Exception` "Invalid graphic format" and nothing is stored.
  void Edit() override;
};

/// The component editor of components whose main property is their picture: a double
/// click edits the property named "Picture" or "Image" and never creates an event.
class FK_API TGraphicEditor : public TDefaultEditor {
  FK_CLASS(TGraphicEditor, TDefaultEditor)
  void EditProperty(const IPtr<IProperty>& Prop, bool& Continue) override;
};

/// Registers the editors: pictures and graphics of any component, and `TGraphicEditor`
/// for `TImage`.
FK_API void RegisterPictureEditors();

} // namespace formkit
