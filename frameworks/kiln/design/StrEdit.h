//===- frameworks/kiln/design/StrEdit.h - String lists and long strings in a dialog ===//
//
// The inspector's editors for text that does not fit its one line: a string
// list property (`TStringListProperty`) and a long string (`TLongStringProperty`,
// `TLongWideStringProperty`) open the string list dialog. From the dialog a
// list can go on into the host's code editor: it then opens as a text module
// of the strings file system, which keeps it in step with the property, and
// the next edit of the property shows that editor instead of the dialog.
// `TStrEditDlg` is the dialog's common part: the buttons, the popup menu with
// its file commands, and the size and place the dialogs share.
//
// Example:
//   RegisterStringEditors();       // from the package's registration
//   Editor->Edit();                // "String List Editor", or the open code editor
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ScalarEditors.h"
#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnStdDialogs.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "tools/ToolsAPI.h"

#include <climits>
#include <functional>

namespace formkit {

FK_RESOURCESTRING(SStrEditDlgCaption, "String List Editor");
FK_RESOURCESTRING(SLoadStringListTitle, "Load string list");
FK_RESOURCESTRING(SSaveStringListTitle, "Save string list");
FK_RESOURCESTRING(SStringListFilter, "Text files (*.TXT)|*.TXT|Config files (*.SYS;*.INI)|*.SYS;*.INI|Batch files "
                                     "(*.BAT)|*.BAT|All files (*.*)|*.*");

/// The modal result of "&Code Editor...": the list goes on into the code editor.
inline constexpr TModalResult mrCodeEditor = 6;

//===----------------------------------------------------------------------===//
// Size and place of a dialog family
//===----------------------------------------------------------------------===//

/// The last Width, Height, Left and Top of a family of dialogs, at the default pixels
/// per inch; kept for the life of the process, never written to disk.
struct TDialogPlacement {
  static constexpr int NotStored = INT_MIN;
  int Width = 0, Height = 0, Left = NotStored, Top = NotStored;
};

/// The placement of `TStrEditDlg` and its descendants.
FK_API TDialogPlacement& StrEditDlgPlacement() noexcept;

namespace detail {
/// Gives `Form` the stored size (not below `MinWidth` by `MinHeight`) scaled to its pixels
/// per inch, and the stored place, or centres it on the main form's monitor, or the
/// screen.
FK_API void RestorePlacement(TCustomForm* Form, const TDialogPlacement& Stored, int MinWidth, int MinHeight);
/// Keeps `Form`'s bounds at the default pixels per inch.
FK_API void StorePlacement(const TCustomForm* Form, TDialogPlacement& Stored) noexcept;
} // namespace detail

//===----------------------------------------------------------------------===//
// The file dialogs of a string list
//===----------------------------------------------------------------------===//

/// An open dialog with a title and a default extension, recorded as `Kind` ("OpenDialog"
/// or "SaveDialog") with its title as the caption.
class FK_API TStringListFileDialog : public TOpenDialog {
  FK_CLASS(TStringListFileDialog, TOpenDialog)

  const String& Title() const noexcept { return FTitle; }
  void SetTitle(const String& Value) { FTitle = Value; }
  /// The extension, without its point, added to a name chosen without one.
  const String& DefaultExt() const noexcept { return FDefaultExt; }
  void SetDefaultExt(const String& Value) { FDefaultExt = Value; }
  void SetKind(const String& Value) { FKind = Value; }

protected:
  TShownDialog Describe() override;
  void Accept(const std::vector<String>& Values) override;

private:
  String FTitle, FDefaultExt;
  String FKind = "OpenDialog";
};

//===----------------------------------------------------------------------===//
// TStrEditDlg
//===----------------------------------------------------------------------===//

/// The string list dialog's common part. The lines and the control that shows them are
/// the descendant's.
class FK_API TStrEditDlg : public TForm {
  FK_CLASS(TStrEditDlg, TForm)
  void Create(TComponent* AOwner) override;
  /// Stores the dialog's size and place for the next one.
  void BeforeDestruction() override;

  static constexpr int MinWidth = 437, MinHeight = 306;

  /// The lines edited; null in the base.
  virtual TStrings* GetLines() { return nullptr; }
  /// Copies `Value` into the lines.
  virtual void SetLines(TStrings* Value);
  /// The control that shows the lines; null in the base.
  virtual TWinControl* GetLinesControl() { return nullptr; }

  /// Whether the lines were changed by the user since `SetModified(false)`.
  bool Modified() const noexcept { return FModified; }
  void SetModified(bool Value) noexcept { FModified = Value; }

  /// Loads the lines from the file the open dialog chooses.
  void FileOpen(TObject* Sender);
  /// Saves the lines to the file the save dialog chooses.
  void FileSave(TObject* Sender);
  /// Opens the help at the form's help context.
  void HelpButtonClick(TObject* Sender);
  /// Takes the size and place of the last dialog of the family.
  void FormShow(TObject* Sender);
  /// Closes the dialog as the code editor button does.
  void CodeEditorItemClick(TObject* Sender);

  TStringListFileDialog* OpenDialog = nullptr;
  TStringListFileDialog* SaveDialog = nullptr;
  TPopupMenu* StringEditorMenu = nullptr;
  TMenuItem* LoadItem = nullptr;
  TMenuItem* SaveItem = nullptr;
  TMenuItem* CodeEditorItem = nullptr;
  TButton* CodeWndBtn = nullptr;
  TButton* OKButton = nullptr;
  TButton* CancelButton = nullptr;
  TButton* HelpButton = nullptr;
  TPanel* PanelBottom = nullptr;

protected:
  /// Esc in a text control acts as the cancel button.
  void CancelOnEscape(std::uint16_t& Key);

  bool FUpdatingPos = false;
  bool FModified = false;
};

//===----------------------------------------------------------------------===//
// Into the code editor
//===----------------------------------------------------------------------===//

/// Shows a dialog over `Strings`, the code editor commands enabled by `CodeEditor`; hands
/// out the dialog (the caller frees it), whether the user changed the lines, and the lines
/// as they are in the dialog. Returns the modal result.
using TEditStringsFunc = std::function<TModalResult(TStrings* Strings, bool CodeEditor, TStrEditDlg*& Dialog,
                                                    bool& Modified, TStrings*& Lines)>;
/// Stores the lines of a dialog closed with OK.
using TOkStringsProc = std::function<void(TStrings* Lines)>;

/// Edits the list `AStrings` of `AComponent`'s property `APropertyName`: shows the list's
/// open code editor when there is one (and answers `mrCancel`), else runs `AEditFunc`.
/// OK stores the lines through `AOkProc`; the code editor result opens the lines as a
/// text module of the strings file system. The code editor is offered only for a class
/// property of a named component owned by `ADesigner`'s named root.
FK_API TModalResult EditStringsWithCodeEditor(TComponent* AComponent, const String& APropertyName, TStrings* AStrings,
                                              const IPtr<IDesigner>& ADesigner, const TEditStringsFunc& AEditFunc,
                                              const TOkStringsProc& AOkProc);

/// Describes to the host the text module of a list sent to the code editor.
class FK_API TStringsModuleCreator : public TInterfacedObject, public IOTACreator, public IOTAModuleCreator {
  FK_CLASS(TStringsModuleCreator, TInterfacedObject)
  FK_INTERFACES(IOTACreator, IOTAModuleCreator)

  TStringsModuleCreator(String FileName, TDateTime Age, String Text)
      : FFileName(std::move(FileName)), FText(std::move(Text)), FAge(Age) {}

  String GetCreatorType() override { return "Text"; }
  bool GetExisting() override { return true; }
  String GetFileSystem() override;
  IPtr<IOTAModule> GetOwner() override { return nullptr; }
  bool GetUnnamed() override { return false; }
  String GetAncestorName() override { return String(); }
  String GetImplFileName() override { return FFileName; }
  String GetIntfFileName() override { return String(); }
  String GetFormName() override { return String(); }
  bool GetMainForm() override { return false; }
  bool GetShowForm() override { return false; }
  bool GetShowSource() override { return true; }
  IPtr<IOTAFile> NewFormFile(const String&, const String&) override { return nullptr; }
  /// The list's text, dated when it left the dialog.
  IPtr<IOTAFile> NewImplSource(const String&, const String&, const String&) override;
  IPtr<IOTAFile> NewIntfSource(const String&, const String&, const String&) override { return nullptr; }
  void FormCreated(const IPtr<IOTAFormEditor>&) override {}

private:
  String FFileName;
  String FText;
  TDateTime FAge;
};

//===----------------------------------------------------------------------===//
// Property editors
//===----------------------------------------------------------------------===//

/// A string list property: the string list dialog, or the code editor.
class FK_API TStringListProperty : public TClassProperty {
  FK_CLASS(TStringListProperty, TClassProperty)
  /// The class property's attributes without sub-properties, with a dialog.
  TPropertyAttributes GetAttributes() override;
  void Edit() override;

  /// A new dialog owned by the application; the caller frees it.
  virtual TStrEditDlg* EditDialog();
  /// The list held by the first pair.
  virtual TStrings* GetStrings();
  /// Has every pair's setter copy `Value`, then tells the designer.
  virtual void SetStrings(TStrings* Value);
};

/// A string too long for the inspector's line, edited as lines. No line break is added
/// at the end.
class FK_API TLongStringProperty : public TStringProperty {
  FK_CLASS(TLongStringProperty, TStringProperty)
  TPropertyAttributes GetAttributes() override;
  void Edit() override;
};

/// The wide form of `TLongStringProperty`.
class FK_API TLongWideStringProperty : public TWideStringProperty {
  FK_CLASS(TLongWideStringProperty, TWideStringProperty)
  TPropertyAttributes GetAttributes() override;
  void Edit() override;
};

/// Registers the string editors of the Kiln package: string lists, the lines of value
/// list editors, and multi-line captions of labels.
FK_API void RegisterStringEditors();

} // namespace formkit
