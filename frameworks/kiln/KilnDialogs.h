//===- frameworks/kiln/KilnDialogs.h - Modal forms and message dialogs ---===//
//
// Modal forms and the standard dialogs, with no one at the keyboard: a test or
// host scripts the answers beforehand, and each dialog that opens takes the
// next one and is recorded (its kind, caption, text, buttons and where it
// stood). A dialog that opens with no answer scripted raises, so a question
// nobody expected never passes unseen.
//
// Example:
//   DialogScript().Answer(mrYes);
//   if (MessageDlg("Save changes?", mtConfirmation, {mbYes, mbNo}, 0) == mrYes) Save();
//   DialogScript().Shown().back().Message;   // "Save changes?"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnForms.h"

#include <deque>
#include <functional>
#include <optional>

namespace formkit {

FK_ENUM(TMsgDlgType, std::uint8_t, mtWarning, mtError, mtInformation, mtConfirmation, mtCustom)
FK_ENUM(TMsgDlgBtn, std::uint8_t, mbYes, mbNo, mbOK, mbCancel, mbAbort, mbRetry, mbIgnore, mbAll,
        mbNoToAll, mbYesToAll, mbHelp, mbClose)
FK_SET(TMsgDlgButtons, TMsgDlgBtn)

/// What a modal form answers; the values are those the form files and the inspector use.
using TModalResult = int;
inline constexpr TModalResult mrNone = 0, mrOk = 1, mrCancel = 2, mrAbort = 3, mrRetry = 4, mrIgnore = 5,
                              mrYes = 6, mrNo = 7, mrClose = 8, mrHelp = 9, mrTryAgain = 10, mrContinue = 11,
                              mrAll = 12, mrNoToAll = 13, mrYesToAll = 14;

/// The answer a button gives, and its name and caption on a message dialog ("OK", "&OK").
FK_API TModalResult ModalResultOfButton(TMsgDlgBtn Button) noexcept;
FK_API String ButtonName(TMsgDlgBtn Button);
FK_API String ButtonCaption(TMsgDlgBtn Button);
/// The caption of a message dialog of a type: "Warning", "Error", "Information",
/// "Confirmation"; empty for `mtCustom`.
FK_API String MessageDialogCaption(TMsgDlgType Type);

//===----------------------------------------------------------------------===//
// The script
//===----------------------------------------------------------------------===//

/// One dialog as it was shown.
struct TShownDialog {
  /// "MessageDlg", "ShowModal" or "InputQuery".
  String Kind;
  String Caption;
  String Message;
  TMsgDlgType DlgType = mtCustom;
  /// The buttons by name, left to right; their screen rectangles and the names of their
  /// parents, in the same order.
  std::vector<String> Buttons;
  std::vector<TRect> ButtonBounds;
  std::vector<String> ButtonParents;
  /// The name of the default button, or empty.
  String DefaultButton;
  /// The form's bounds while it was up.
  TRect Bounds;
  /// The prompts and the values it was opened with (input queries).
  std::vector<String> Prompts;
  std::vector<String> Values;
};

/// The answers scripted for the dialogs to come, and the record of those shown.
class FK_API TDialogScript {
public:
  /// The next dialog answers `Result`; an input query also takes `Values` as typed.
  void Answer(TModalResult Result, std::vector<String> Values = {});
  /// The next dialog, a form shown modally, is answered by `User`: what a person does
  /// on the open form (checks a radio button, chooses an item, clicks a button) and the
  /// modal result that closes it.
  void AnswerBy(std::function<TModalResult(TCustomForm& Form)> User);
  int PendingAnswers() const noexcept { return static_cast<int>(FAnswers.size()); }
  const std::vector<TShownDialog>& Shown() const noexcept { return FShown; }
  /// Drops the answers not taken and the record.
  void Clear() noexcept;

  /// For the dialogs: records `Dialog` and gives the next answer; raises
  /// `EInvalidOperation` "No answer is scripted for the dialog \"%s\"" when there is
  /// none, and then nothing is recorded.
  [[nodiscard]] std::pair<TModalResult, std::vector<String>> Take(TShownDialog Dialog);
  /// `Take` for a form shown modally: an answer given by `AnswerBy` acts on `Form`.
  [[nodiscard]] TModalResult TakeFor(TShownDialog Dialog, TCustomForm& Form);

private:
  struct TAnswer {
    TModalResult Result = mrNone;
    std::vector<String> Values;
    std::function<TModalResult(TCustomForm&)> User;
  };
  [[nodiscard]] TAnswer Next(TShownDialog Dialog);
  std::deque<TAnswer> FAnswers;
  std::vector<TShownDialog> FShown;
};

/// The process's script.
FK_API TDialogScript& DialogScript();

//===----------------------------------------------------------------------===//
// Modal forms and dialogs
//===----------------------------------------------------------------------===//

/// Shows `Form` modally and answers the scripted result; the form is hidden afterwards.
/// The record lists the form's buttons (at any depth) in the order of their left edges.
FK_API TModalResult ShowModal(TCustomForm* Form);

/// What a person's click on button `Name` of a modal form answers: the button's
/// `OnClick` runs, and the result is the form's modal result when the click set one, else
/// the button's. Raises `EInvalidOperation` "Form %s has no button %s" for a name that is
/// no enabled button of the form.
FK_API TModalResult ClickButton(TCustomForm& Form, const String& Name);

/// Shows a message dialog modally, recorded as "MessageDlg" of `DlgType`.
FK_API TModalResult ShowMessageDialog(TCustomForm* Form, TMsgDlgType DlgType);

/// Builds a message dialog: a form captioned by the type, a label "Message" with the
/// text, and a button for each member of `Buttons` named and answering as its kind; the
/// default one is `DefaultButton`, or the first when none is given.
[[nodiscard]] FK_API TObjectGuard<TCustomForm> CreateMessageDialog(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons,
                                        std::optional<TMsgDlgBtn> DefaultButton = std::nullopt);

/// The framework's plain message dialog, centred on the screen, or with its top-left
/// corner at (`X`, `Y`) when both are 0 or more; its default button the first one unless
/// `DefaultButton` is given.
FK_API TModalResult MessageDlgPos(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons, int HelpCtx,
                                  int X, int Y, std::optional<TMsgDlgBtn> DefaultButton = std::nullopt);

/// Whether an input dialog may close with the values typed.
using TInputCloseQueryFunc = std::function<bool(const std::vector<String>& Values)>;

/// The framework's input dialog: one edit per prompt. True when closed with OK, and then
/// `Values` holds what was typed. An OK that `CloseQuery` refuses keeps the dialog open:
/// the next scripted answer is taken.
FK_API bool InputQuery(const String& Caption, const std::vector<String>& Prompts, std::vector<String>& Values,
                       const TInputCloseQueryFunc& CloseQuery = nullptr);

} // namespace formkit
