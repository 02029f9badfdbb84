//===- frameworks/kiln/design/RecoveryDialogs.h - Asking the user about a broken module ===//
//
// Three small modal dialogs on Kiln forms, each behind one function, that ask
// the user what to do when a stored module no longer fits what it refers to:
// `FormInheritenceRecovery` when a descendant recorded changes to a component
// its ancestor no longer has, `FormReadError` when reading a module fails, and
// `RedirectLinks` when a module links to a module that is not open. The Kiln
// root asks through them unless the host answers by its own hooks.
//
// Example:
//   String Name = "Button1";
//   switch (FormInheritenceRecovery("Form2", "Form1", Name, "Button2,Button3", false)) {
//   case rrRename: ...   // Name now holds the chosen candidate
//   }
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/root/ComponentRoot.h"
#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnListCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit {

FK_RESOURCESTRING(SRemoveLinks, "<Remove links>");
FK_RESOURCESTRING(sReadErrorCaption, "Error Reading Form: '%s'");

/// The modal result of "Ignore All" on the read error dialog.
inline constexpr TModalResult mrIgnoreAll = 42;

//===----------------------------------------------------------------------===//
// The functions
//===----------------------------------------------------------------------===//

/// Asks what became of component `ComponentName`, whose changes form `FormName`
/// recorded although its ancestor `AncestorName` no longer has it. `Candidates` (comma
/// text) are the names it may have been renamed to; `Nested` hides the choice to create
/// it anew. A rename writes the chosen name into `ComponentName`.
FK_API TRecoveryResult FormInheritenceRecovery(const String& FormName, const String& AncestorName,
                                               String& ComponentName, const String& Candidates, bool Nested);

/// Asks whether to go on past the read error `Message` of module `ModuleName` (may be
/// empty): 1 Ignore, 2 Cancel, `mrIgnoreAll` (42) Ignore All. The host's wait dialog is
/// hidden while it asks.
FK_API int FormReadError(const String& Message, const String& ModuleName);

/// Asks which open module `Root`'s links to the missing module `ReferenceName` go to
/// instead, and redirects them there, or removes them.
FK_API void RedirectLinks(TComponent* Root, const String& ReferenceName);

//===----------------------------------------------------------------------===//
// The host's wait dialog
//===----------------------------------------------------------------------===//

/// The host's "please wait" window, which a question must not stand behind. A host that
/// has one shows and hides it through this class and hears the changes.
class FK_API TIDEWaitDialog {
public:
  static bool IsShowing() noexcept { return FShowing; }
  static void Show();
  static void Hide();
  /// Told each change of visibility.
  static inline std::function<void(bool Showing)> OnShowingChanged;

private:
  static inline bool FShowing = false;
};

//===----------------------------------------------------------------------===//
// The forms
//===----------------------------------------------------------------------===//

/// "Ancestor Component Not Found": deleted, renamed to a candidate, or created anew.
class FK_API TRecoverFormInheritence : public TForm {
  FK_CLASS(TRecoverFormInheritence, TForm)
  void Create(TComponent* AOwner) override;
  /// Fills the dialog for one question.
  void Setup(const String& FormName, const String& AncestorName, const String& ComponentName,
             const String& Candidates, bool Nested);
  /// The radio buttons' click: the candidates are chosen from only with "renamed".
  void OptionsChanged(TObject* Sender);

  TLabel* MessageLbl = nullptr;
  TPanel* GroupBox1 = nullptr;
  TRadioButton* DeletedCheck = nullptr;
  TRadioButton* RenamedCheck = nullptr;
  TComboBox* RenameText = nullptr;
  TRadioButton* CreateCheck = nullptr;
  TButton* OKBtn = nullptr;
  TButton* CancelBtn = nullptr;
};

/// "Error Reading Form": ignore this error, all of them, or cancel the read.
class FK_API TReadErrorDlg : public TForm {
  FK_CLASS(TReadErrorDlg, TForm)
  void Create(TComponent* AOwner) override;
  /// The Ignore button takes the focus.
  void FormShow(TObject* Sender);
  /// Closes with `mrIgnoreAll`.
  void IgnoreAllClick(TObject* Sender);

  TPanel* pnMain = nullptr;
  TBevel* Bevel1 = nullptr;
  TLabel* Label1 = nullptr;
  TPanel* pnButtons = nullptr;
  TButton* IgnoreButton = nullptr;
  TButton* IgnoreAllButton = nullptr;
  TButton* CancelButton = nullptr;
};

/// "Link Redirection": the module the links go to, or "<Remove links>".
class FK_API TLinkRedirect : public TForm {
  FK_CLASS(TLinkRedirect, TForm)
  void Create(TComponent* AOwner) override;
  void OKBtnClick(TObject* Sender);
  void CancelBtnClick(TObject* Sender);

  TBevel* Bevel1 = nullptr;
  TLabel* InfoLabel = nullptr;
  TListBox* LinkNames = nullptr;
  TButton* OKBtn = nullptr;
  TButton* CancelBtn = nullptr;
  TButton* HelpBtn = nullptr;
};

} // namespace formkit
