//===- desktop/DeskDialogs.cpp - Dialogs safe in the middle of a load ----===//
#include "desktop/DeskUtil.h"

#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"

#include <algorithm>

namespace formkit {

bool DialogsUnlockDrawing = true;
bool DialogsStyled = true;
bool DialogsTitleBar = true;

namespace {
constexpr int ButtonGap = 8;

/// Unfreezes drawing while a dialog is up; the guard freezes it again.
[[nodiscard]] auto ThawDrawingForDialog() {
  bool Thawed = DialogsUnlockDrawing && TIDEDesktopService::IsDrawingLocked();
  if (Thawed) TIDEDesktopService::UnLockDrawing();
  return Finally([Thawed]() noexcept {
    if (Thawed) RunIgnoringExceptions([] { TIDEDesktopService::LockDrawing(); });
  });
}

/// Moves the dialog's buttons onto a panel along its bottom, right-aligned and scaled to
/// the form's resolution.
void PlaceButtonsOnPanel(TCustomForm* Form) {
  std::vector<TButton*> Buttons;
  for (int I = 0; I < Form->ControlCount(); ++I)
    if (auto* B = dynamic_cast<TButton*>(Form->Controls(I))) Buttons.push_back(B);
  std::sort(Buttons.begin(), Buttons.end(), [](TButton* A, TButton* B) { return A->Left() < B->Left(); });
  auto* Panel = CreateComponentOf<TPanel>(Form);
  Panel->SetName("pnBottomButtons");
  Panel->SetCaption(String());
  Panel->SetBevelOuter(bvNone);
  int Gap = Form->ScaleValue(ButtonGap);
  int Height = Buttons.empty() ? 0 : Form->ScaleValue(Buttons.front()->Height());
  Panel->SetHeight(Height + 2 * Gap);
  Panel->SetParent(Form);
  Panel->SetAlign(alBottom);
  int X = Panel->ClientWidth() - Gap;
  for (auto It = Buttons.rbegin(); It != Buttons.rend(); ++It) {
    TButton* B = *It;
    int W = Form->ScaleValue(B->Width());
    X -= W;
    B->SetParent(Panel);
    B->SetBounds(X, Gap, W, Height);
    X -= Gap;
  }
}

TModalResult ShowStyled(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons,
                        std::optional<TMsgDlgBtn> DefaultButton, int X, int Y) {
  TObjectGuard<TCustomForm> Form = CreateMessageDialog(Msg, DlgType, Buttons, DefaultButton);
  PlaceButtonsOnPanel(Form.Get());
  TRect Work = Screen()->WorkAreaRect();
  if (X < 0 || Y < 0) {
    X = Work.Left + (Work.Width() - Form->Width()) / 2;
    Y = Work.Top + (Work.Height() - Form->Height()) / 2;
  }
  Form->SetBounds(X, Y, Form->Width(), Form->Height());
  return ShowMessageDialog(Form.Get(), DlgType);
}

TModalResult ShowDialog(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons, int HelpCtx,
                        std::optional<TMsgDlgBtn> DefaultButton, int X, int Y) {
  auto Refreeze = ThawDrawingForDialog();
  if (DialogsStyled || DialogsTitleBar) return ShowStyled(Msg, DlgType, Buttons, DefaultButton, X, Y);
  return MessageDlgPos(Msg, DlgType, Buttons, HelpCtx, X, Y, DefaultButton);
}
} // namespace

TModalResult TIDEDialogsService::MessageDlg(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons,
                                            int HelpCtx) {
  return ShowDialog(Msg, DlgType, Buttons, HelpCtx, std::nullopt, -1, -1);
}

TModalResult TIDEDialogsService::MessageDlg(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons,
                                            int HelpCtx, TMsgDlgBtn DefaultButton) {
  return ShowDialog(Msg, DlgType, Buttons, HelpCtx, DefaultButton, -1, -1);
}

TModalResult TIDEDialogsService::MessageDlgPos(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons,
                                               int HelpCtx, int X, int Y, TMsgDlgBtn DefaultButton) {
  return ShowDialog(Msg, DlgType, Buttons, HelpCtx, DefaultButton, X, Y);
}

void TIDEDialogsService::ShowMessage(const String& Msg) { (void)MessageDlg(Msg, mtCustom, {mbOK}, 0); }

bool TIDEDialogsService::InputQuery(const String& Caption, const std::vector<String>& Prompts,
                                    std::vector<String>& Values, const TInputCloseQueryFunc& CloseQuery) {
  auto Refreeze = ThawDrawingForDialog();
  return formkit::InputQuery(Caption, Prompts, Values, CloseQuery);
}

bool TIDEDialogsService::InputQuery(const String& Caption, const String& Prompt, String& Value) {
  std::vector<String> Values{Value};
  if (!InputQuery(Caption, {Prompt}, Values)) return false;
  Value = Values.front();
  return true;
}

String TIDEDialogsService::InputBox(const String& Caption, const String& Prompt, const String& Default) {
  String Value = Default;
  return InputQuery(Caption, Prompt, Value) ? Value : Default;
}

} // namespace formkit
