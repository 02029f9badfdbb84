//===- frameworks/kiln/KilnDialogs.cpp - Modal forms and message dialogs -===//
#include "frameworks/kiln/KilnDialogs.h"

#include "frameworks/kiln/KilnStdCtrls.h"

#include <algorithm>
#include <array>

namespace formkit {

FK_RESOURCESTRING(SNoSuchButton, "Form %s has no button %s");
FK_RESOURCESTRING(SNoScriptedAnswer, "No answer is scripted for the dialog \"%s\"");
FK_RESOURCESTRING(SMsgDlgWarning, "Warning");
FK_RESOURCESTRING(SMsgDlgError, "Error");
FK_RESOURCESTRING(SMsgDlgInformation, "Information");
FK_RESOURCESTRING(SMsgDlgConfirm, "Confirmation");

namespace {
struct TButtonKind {
  const char* Name;
  const char* Caption;
  TModalResult Result;
};
constexpr std::array<TButtonKind, 12> ButtonKinds{{{"Yes", "&Yes", mrYes},
                                                   {"No", "&No", mrNo},
                                                   {"OK", "OK", mrOk},
                                                   {"Cancel", "Cancel", mrCancel},
                                                   {"Abort", "&Abort", mrAbort},
                                                   {"Retry", "&Retry", mrRetry},
                                                   {"Ignore", "&Ignore", mrIgnore},
                                                   {"All", "&All", mrAll},
                                                   {"NoToAll", "N&o to All", mrNoToAll},
                                                   {"YesToAll", "Yes to &All", mrYesToAll},
                                                   {"Help", "&Help", mrNone},
                                                   {"Close", "&Close", mrClose}}};

const TButtonKind& KindOf(TMsgDlgBtn B) noexcept { return ButtonKinds[static_cast<std::size_t>(B)]; }

constexpr int ButtonWidth = 75;
constexpr int ButtonHeight = 25;
constexpr int ButtonSpacing = 8;
constexpr int DialogMargin = 8;
/// The width the headless framework gives one character of text.
constexpr int CharWidth = 7;

/// Every button of a form at any depth.
void CollectButtons(TWinControl* Parent, std::vector<TButton*>& Out) {
  for (int I = 0; I < Parent->ControlCount(); ++I) {
    TControl* C = Parent->Controls(I);
    if (auto* B = dynamic_cast<TButton*>(C)) Out.push_back(B);
    else if (auto* W = dynamic_cast<TWinControl*>(C)) CollectButtons(W, Out);
  }
}

TRect CentredOnScreen(int Width, int Height) {
  TRect Work = Screen()->WorkAreaRect();
  return Bounds(Work.Left + (Work.Width() - Width) / 2, Work.Top + (Work.Height() - Height) / 2, Width, Height);
}
} // namespace

TModalResult ModalResultOfButton(TMsgDlgBtn Button) noexcept { return KindOf(Button).Result; }
String ButtonName(TMsgDlgBtn Button) { return KindOf(Button).Name; }
String ButtonCaption(TMsgDlgBtn Button) { return KindOf(Button).Caption; }

String MessageDialogCaption(TMsgDlgType Type) {
  switch (Type) {
  case mtWarning: return LoadResString(SMsgDlgWarning);
  case mtError: return LoadResString(SMsgDlgError);
  case mtInformation: return LoadResString(SMsgDlgInformation);
  case mtConfirmation: return LoadResString(SMsgDlgConfirm);
  default: return String();
  }
}

//===----------------------------------------------------------------------===//
// TDialogScript
//===----------------------------------------------------------------------===//

void TDialogScript::Answer(TModalResult Result, std::vector<String> Values) {
  FAnswers.push_back({Result, std::move(Values), nullptr});
}

void TDialogScript::AnswerBy(std::function<TModalResult(TCustomForm& Form)> User) {
  FAnswers.push_back({mrNone, {}, std::move(User)});
}

void TDialogScript::Clear() noexcept {
  FAnswers.clear();
  FShown.clear();
}

TDialogScript::TAnswer TDialogScript::Next(TShownDialog Dialog) {
  if (FAnswers.empty()) throw EInvalidOperation(SNoScriptedAnswer, Dialog.Caption);
  FShown.push_back(std::move(Dialog));
  TAnswer A = std::move(FAnswers.front());
  FAnswers.pop_front();
  return A;
}

std::pair<TModalResult, std::vector<String>> TDialogScript::Take(TShownDialog Dialog) {
  TAnswer A = Next(std::move(Dialog));
  return {A.Result, std::move(A.Values)};
}

TModalResult TDialogScript::TakeFor(TShownDialog Dialog, TCustomForm& Form) {
  TAnswer A = Next(std::move(Dialog));
  return A.User ? A.User(Form) : A.Result;
}

TDialogScript& DialogScript() {
  static TDialogScript Script;
  return Script;
}

//===----------------------------------------------------------------------===//
// Modal forms and dialogs
//===----------------------------------------------------------------------===//

namespace {
TModalResult ShowRecorded(TCustomForm* Form, const char* Kind, TMsgDlgType DlgType) {
  TShownDialog D;
  D.Kind = Kind;
  D.DlgType = DlgType;
  D.Caption = Form->Caption();
  D.Bounds = Form->BoundsRect();
  std::vector<TButton*> Buttons;
  CollectButtons(Form, Buttons);
  std::stable_sort(Buttons.begin(), Buttons.end(), [](TButton* A, TButton* B) {
    return A->ClientToScreen({0, 0}).X < B->ClientToScreen({0, 0}).X;
  });
  for (TButton* B : Buttons) {
    D.Buttons.push_back(B->Name());
    TPoint P = B->Parent()->ClientToScreen(B->BoundsRect().TopLeft());
    D.ButtonBounds.push_back(Bounds(P.X, P.Y, B->Width(), B->Height()));
    D.ButtonParents.push_back(B->Parent()->Name());
    if (B->Default()) D.DefaultButton = B->Name();
  }
  if (auto* Msg = dynamic_cast<TControl*>(Form->FindComponent("Message"))) D.Message = Msg->Caption();
  Form->Show();
  auto HideAgain = Finally([Form]() noexcept { RunIgnoringExceptions([Form] { Form->Hide(); }); });
  return DialogScript().TakeFor(std::move(D), *Form);
}
} // namespace

TModalResult ClickButton(TCustomForm& Form, const String& Name) {
  auto* Button = dynamic_cast<TButton*>(Form.FindComponent(Name));
  if (!Button || !Button->Enabled()) throw EInvalidOperation(SNoSuchButton, Form.Name(), Name);
  Form.SetModalResult(mrNone);
  Button->Click();
  return Form.ModalResult() != mrNone ? Form.ModalResult() : Button->ModalResult();
}

TModalResult ShowModal(TCustomForm* Form) { return ShowRecorded(Form, "ShowModal", mtCustom); }

TModalResult ShowMessageDialog(TCustomForm* Form, TMsgDlgType DlgType) {
  return ShowRecorded(Form, "MessageDlg", DlgType);
}

TObjectGuard<TCustomForm> CreateMessageDialog(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons,
                                              std::optional<TMsgDlgBtn> DefaultButton) {
  TObjectGuard<TCustomForm> Made(CreateComponentOf<TForm>(nullptr));
  TCustomForm* Form = Made.Get();
  Form->SetBorderStyle(bsDialog);
  Form->SetCaption(MessageDialogCaption(DlgType));
  auto* Text = CreateComponentOf<TLabel>(Form);
  Text->SetName("Message");
  Text->SetParent(Form);
  Text->SetCaption(Msg);
  Text->SetBounds(DialogMargin, DialogMargin, CharWidth * static_cast<int>(Msg.size()), 13);
  int Count = 0;
  for (int B = mbYes; B <= mbClose; ++B) Count += Buttons.Contains(static_cast<TMsgDlgBtn>(B)) ? 1 : 0;
  int Row = Count * ButtonWidth + std::max(Count - 1, 0) * ButtonSpacing;
  Form->SetClientWidth(std::max(Text->Width(), Row) + 2 * DialogMargin);
  Form->SetClientHeight(Text->Height() + ButtonHeight + 4 * DialogMargin);
  int X = (Form->ClientWidth() - Row) / 2;
  bool First = true;
  for (int I = mbYes; I <= mbClose; ++I) {
    auto B = static_cast<TMsgDlgBtn>(I);
    if (!Buttons.Contains(B)) continue;
    auto* Button = CreateComponentOf<TButton>(Form);
    Button->SetName(ButtonName(B));
    Button->SetParent(Form);
    Button->SetCaption(ButtonCaption(B));
    Button->SetModalResult(ModalResultOfButton(B));
    Button->SetCancel(B == mbCancel || (B == mbNo && !Buttons.Contains(mbCancel)));
    Button->SetDefault(DefaultButton ? B == *DefaultButton : First);
    Button->SetBounds(X, Text->Height() + 3 * DialogMargin, ButtonWidth, ButtonHeight);
    X += ButtonWidth + ButtonSpacing;
    First = false;
  }
  return Made;
}

TModalResult MessageDlgPos(const String& Msg, TMsgDlgType DlgType, TMsgDlgButtons Buttons, int, int X, int Y,
                           std::optional<TMsgDlgBtn> DefaultButton) {
  TObjectGuard<TCustomForm> Form = CreateMessageDialog(Msg, DlgType, Buttons, DefaultButton);
  TRect R = CentredOnScreen(Form->Width(), Form->Height());
  if (X >= 0 && Y >= 0) R = Bounds(X, Y, Form->Width(), Form->Height());
  Form->SetBoundsRect(R);
  return ShowMessageDialog(Form.Get(), DlgType);
}

bool InputQuery(const String& Caption, const std::vector<String>& Prompts, std::vector<String>& Values,
                const TInputCloseQueryFunc& CloseQuery) {
  for (;;) {
    TShownDialog D;
    D.Kind = "InputQuery";
    D.Caption = Caption;
    D.Prompts = Prompts;
    D.Values = Values;
    D.Buttons = {"OK", "Cancel"};
    D.DefaultButton = "OK";
    auto [Result, Typed] = DialogScript().Take(std::move(D));
    if (Result != mrOk) return false;
    Typed.resize(Values.size());
    if (!CloseQuery || CloseQuery(Typed)) {
      Values = std::move(Typed);
      return true;
    }
  }
}

} // namespace formkit
