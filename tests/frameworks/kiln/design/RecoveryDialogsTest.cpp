//===- tests/frameworks/kiln/design/RecoveryDialogsTest.cpp - Asking about a broken module ===//
//
// The three recovery dialogs as a person meets them: their captions, texts and
// choices, what each answer does, and the Kiln root asking through them while a
// module is read, saved or reverted.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/RecoveryDialogs.h"
#include "platform/ScopeGuard.h"
#include "tests/frameworks/kiln/design/ModuleFilesFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

struct RecoveryDialogsTest : ModuleFilesTest {
  void TearDown() override {
    TIDEWaitDialog::OnShowingChanged = nullptr;
    if (TIDEWaitDialog::IsShowing()) TIDEWaitDialog::Hide();
    ModuleFilesTest::TearDown();
  }
  /// Saves Form1, whose Label1 focuses Edit1 of Form2, and closes both: Form1 opened
  /// alone then links to a module that is not open.
  void SaveForm1LinkedToForm2() {
    IPtr<IRoot> Form1 = NewFormAt("Form1");
    IPtr<IRoot> Form2 = NewFormAt("Form2");
    auto* Label =
        static_cast<TLabel*>(KilnRoot(Form1)->CreateComponent(TLabel::StaticClass(), Form1->GetRoot(), 8, 8, 65, 17));
    Label->SetFocusControl(static_cast<TWinControl*>(
        KilnRoot(Form2)->CreateComponent(TEdit::StaticClass(), Form2->GetRoot(), 8, 8, 121, 23)));
    KilnRoot(Form1)->Modified();
    Form1->Save();
    Form1->Close();
    Form2->Close();
  }
  /// Answers the next dialog by `Act` on its form, as `T`.
  template <class T> static void AnswerOn(std::function<TModalResult(T&)> Act) {
    DialogScript().AnswerBy([Act](TCustomForm& Form) { return Act(dynamic_cast<T&>(Form)); });
  }
};

TEST_F(RecoveryDialogsTest, TheLostAncestorComponentIsDeletedRenamedOrCreatedAsChosen) {
  // No candidates, nested: only "deleted" can be chosen, and it is the preset answer.
  String Name = "Button1";
  AnswerOn<TRecoverFormInheritence>([](TRecoverFormInheritence& D) {
    EXPECT_EQ(D.Caption(), "Ancestor Component Not Found");
    EXPECT_EQ(D.ClientWidth(), 309);
    EXPECT_EQ(D.ClientHeight(), 193);
    EXPECT_EQ(D.BorderStyle(), bsDialog);
    EXPECT_EQ(D.MessageLbl->Caption(), "Modifications to component Button1 were recorded in form Form2 but the "
                                       "ancestor component was not found in form Form1.");
    EXPECT_TRUE(D.MessageLbl->WordWrap());
    EXPECT_EQ(D.DeletedCheck->Caption(), "Component was deleted, delete reference.");
    EXPECT_EQ(D.RenamedCheck->Caption(), "Component was renamed to:");
    EXPECT_EQ(D.CreateCheck->Caption(), "Create component as new on the descendent.");
    EXPECT_TRUE(D.DeletedCheck->Checked());
    EXPECT_FALSE(D.RenamedCheck->Enabled());
    EXPECT_FALSE(D.CreateCheck->Visible());
    EXPECT_EQ(D.RenameText->TabOrder(), 2);
    return ClickButton(D, "OKBtn");
  });
  EXPECT_EQ(FormInheritenceRecovery("Form2", "Form1", Name, "", true), rrDelete);
  EXPECT_EQ(Name, "Button1");
  EXPECT_EQ(DialogScript().Shown().back().Buttons, (std::vector<String>{"OKBtn", "CancelBtn"}));
  EXPECT_EQ(DialogScript().Shown().back().DefaultButton, "OKBtn");

  // Renamed to the second candidate: choosing "renamed" opens the list to the user.
  AnswerOn<TRecoverFormInheritence>([](TRecoverFormInheritence& D) {
    EXPECT_EQ(D.RenameText->Items()->CommaText(), "Button2,Button3");
    EXPECT_EQ(D.RenameText->ItemIndex(), 0);
    EXPECT_FALSE(D.RenameText->Enabled());
    EXPECT_TRUE(D.CreateCheck->Visible());
    D.RenamedCheck->SetChecked(true);
    EXPECT_TRUE(D.RenameText->Enabled());
    EXPECT_EQ(D.ActiveControl(), D.RenameText);
    EXPECT_FALSE(D.DeletedCheck->Checked());
    D.RenameText->SetItemIndex(1);
    return ClickButton(D, "OKBtn");
  });
  EXPECT_EQ(FormInheritenceRecovery("Form2", "Form1", Name, "Button2,Button3", false), rrRename);
  EXPECT_EQ(Name, "Button3");

  AnswerOn<TRecoverFormInheritence>([](TRecoverFormInheritence& D) {
    D.CreateCheck->SetChecked(true);
    EXPECT_FALSE(D.RenameText->Enabled());
    return ClickButton(D, "OKBtn");
  });
  EXPECT_EQ(FormInheritenceRecovery("Form2", "Form1", Name, "Button2", false), rrCreate);
  AnswerOn<TRecoverFormInheritence>([](TRecoverFormInheritence& D) {
    D.RenamedCheck->SetChecked(true);
    return ClickButton(D, "CancelBtn");
  });
  EXPECT_EQ(FormInheritenceRecovery("Form2", "Form1", Name, "Button2", false), rrCancel);
  EXPECT_EQ(Name, "Button3") << "only a rename changes the name";
}

TEST_F(RecoveryDialogsTest, AReadErrorIsIgnoredIgnoredForTheRestOfTheReadOrCancelled) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  BuildSample(Form);
  Form->Save();
  Form->Close();
  String Text = TextOf(ToTextForm(FileBytes(PathOf("Form1.kfm"))));
  Text.replace(Text.find("    Caption = \"Go\"\n"), 0, "    Shade = 3\n");
  Text.replace(Text.find("    Caption = \"Name:\"\n"), 0, "    Glow = 1\n");
  WriteFile(PathOf("Broken.kfm"), std::vector<std::uint8_t>(Text.begin(), Text.end()));
  std::vector<bool> WaitShowing;
  TIDEWaitDialog::Show();
  TIDEWaitDialog::OnShowingChanged = [&](bool Showing) { WaitShowing.push_back(Showing); };

  // Ignored twice: the read goes on past both errors.
  AnswerOn<TReadErrorDlg>([](TReadErrorDlg& D) {
    EXPECT_EQ(D.Caption(), "Error Reading Form: 'Broken'");
    EXPECT_EQ(D.Label1->Caption(), "Error reading Button1.Shade: Property Shade does not exist.  Ignore the error and "
                                   "continue?  NOTE: Ignoring the error may cause components to be deleted or "
                                   "property values to be lost.");
    EXPECT_EQ(D.Font()->Name(), "Segoe UI");
    EXPECT_EQ(D.ActiveControl(), D.IgnoreButton) << "the Ignore button has the focus";
    EXPECT_FALSE(TIDEWaitDialog::IsShowing()) << "the wait dialog is out of the way";
    return ClickButton(D, "IgnoreButton");
  });
  DialogScript().Answer(mrOk);
  IPtr<IRoot> Ignored = OpenAt("Broken.kfm");
  EXPECT_EQ(DialogScript().Shown().size(), 2u);
  EXPECT_EQ(DialogScript().Shown()[0].Buttons, (std::vector<String>{"IgnoreButton", "IgnoreAllButton", "CancelButton"}));
  EXPECT_EQ(static_cast<TButton*>(Ignored->GetRoot()->FindComponent("Button1"))->Caption(), "Go");
  EXPECT_TRUE(TIDEWaitDialog::IsShowing()) << "the wait dialog comes back";
  EXPECT_EQ(WaitShowing, (std::vector<bool>{false, true, false, true}));
  Ignored->Close();

  // Ignore All: one question for the whole read, which goes on to the end.
  AnswerOn<TReadErrorDlg>([](TReadErrorDlg& D) { return ClickButton(D, "IgnoreAllButton"); });
  IPtr<IRoot> All = OpenAt("Broken.kfm");
  EXPECT_EQ(DialogScript().Shown().size(), 3u);
  EXPECT_NE(All->GetRoot()->FindComponent("Label1"), nullptr);
  All->Close();

  // Cancelled: nothing opens.
  int Roots = Designer->GetRootsCount();
  AnswerOn<TReadErrorDlg>([](TReadErrorDlg& D) { return ClickButton(D, "CancelButton"); });
  EXPECT_THROW(OpenAt("Broken.kfm"), EReadError);
  EXPECT_EQ(Designer->GetRootsCount(), Roots);
  EXPECT_TRUE(TIDEWaitDialog::IsShowing());

  // Without a module name the stored caption stays.
  DialogScript().Answer(mrCancel);
  EXPECT_EQ(FormReadError("Bad", ""), mrCancel);
  EXPECT_EQ(DialogScript().Shown().back().Caption, "Error Reading Form");
}

TEST_F(RecoveryDialogsTest, AnAncestorComponentLostOnTheWayIsRecoveredThroughTheDialog) {
  SaveDescendantThenLoseItsButton();

  AnswerOn<TRecoverFormInheritence>([](TRecoverFormInheritence& D) {
    EXPECT_EQ(D.MessageLbl->Caption(), "Modifications to component Button1 were recorded in form Form2 but the "
                                       "ancestor component was not found in form Form1.");
    D.RenamedCheck->SetChecked(true);
    return ClickButton(D, "OKBtn");
  });
  IPtr<IRoot> Renamed = OpenAt("Form2.kfm", "TForm1");
  EXPECT_EQ(static_cast<TButton*>(Renamed->GetRoot()->FindComponent("Button2"))->Caption(), "Mine");
}

TEST_F(RecoveryDialogsTest, LinksGoToTheFirstOpenModuleThatHoldsWhatTheyNameOrAreRemoved) {
  SaveForm1LinkedToForm2();
  // Form3 lacks Edit1; Form4 and Form5 have it: Form4 comes first.
  IPtr<IRoot> Form3 = NewFormAt("Form3");
  IPtr<IRoot> Form5 = NewFormAt("Form5");
  IPtr<IRoot> Form4 = NewFormAt("Form4");
  for (const IPtr<IRoot>& Holder : {Form5, Form4})
    KilnRoot(Holder)->CreateComponent(TEdit::StaticClass(), Holder->GetRoot(), 8, 8, 121, 23);
  IPtr<IRoot> Alone = OpenAt("Form1.kfm");
  TComponent* Root = Alone->GetRoot();
  // The host finds a link's module among the open ones, as an environment does.
  int Finder = RegisterFindGlobalComponentProc([this](const String& Name) -> TComponent* {
    IPtr<IRoot> Found = Designer->FindRoot(Name);
    return Found ? Found->GetRoot() : nullptr;
  });
  auto Unregister = Finally([Finder]() noexcept { UnregisterFindGlobalComponentProc(Finder); });

  AnswerOn<TLinkRedirect>([](TLinkRedirect& D) {
    EXPECT_EQ(D.Caption(), "Link Redirection");
    EXPECT_EQ(D.InfoLabel->Caption(), "Redirect form Form1's links from Form2 to:");
    EXPECT_EQ(D.LinkNames->Items()->CommaText(), "\"<Remove links>\",Form3,Form4,Form5");
    EXPECT_EQ(D.LinkNames->ItemIndex(), 2);
    return ClickButton(D, "CancelBtn");
  });
  RedirectLinks(Root, "Form2");
  EXPECT_EQ(static_cast<TLabel*>(Root->FindComponent("Label1"))->FocusControl(), nullptr) << "cancelled: no change";

  AnswerOn<TLinkRedirect>([](TLinkRedirect& D) { return ClickButton(D, "OKBtn"); });
  RedirectLinks(Root, "Form2");
  TWinControl* Focus = static_cast<TLabel*>(Root->FindComponent("Label1"))->FocusControl();
  ASSERT_NE(Focus, nullptr);
  EXPECT_EQ(Focus->Owner(), Form4->GetRoot());
}

TEST_F(RecoveryDialogsTest, OkWithNothingChosenOrWithRemoveLinksDropsTheLinks) {
  SaveForm1LinkedToForm2();
  IPtr<IRoot> Alone = OpenAt("Form1.kfm");
  std::vector<String> Pending;
  GetFixupReferenceNames(Alone->GetRoot(), Pending);
  EXPECT_EQ(Pending, std::vector<String>{"Form2"});
  AnswerOn<TLinkRedirect>([](TLinkRedirect& D) {
    D.LinkNames->SetItemIndex(0);
    return ClickButton(D, "OKBtn");
  });
  RedirectLinks(Alone->GetRoot(), "Form2");
  Pending.clear();
  GetFixupReferenceNames(Alone->GetRoot(), Pending);
  EXPECT_TRUE(Pending.empty());
}

TEST_F(RecoveryDialogsTest, RevertingAsksBeforeItDeletesADescendantsOwnComponents) {
  IPtr<IRoot> Form1 = NewFormAt("Form1");
  KilnRoot(Form1)->CreateComponent(TPanel::StaticClass(), Form1->GetRoot(), 8, 8, 185, 41);
  IPtr<IRoot> Form2 = NewFormAt("Form2", "Form1");
  TComponent* Panel = Form2->GetRoot()->FindComponent("Panel1");
  KilnRoot(Form2)->CreateComponent(TEdit::StaticClass(), Panel, 8, 8, 121, 23);
  KilnRoot(Form2)->SelectComponent(Panel);
  DialogScript().Answer(mrNo);
  KilnRoot(Form2)->Command(dmRevert);
  EXPECT_EQ(DialogScript().Shown().back().Message,
            "Reverting 'Panel1' deletes all contained components not found in the ancestor and will delete the "
            "following: Edit1.  Continue?");
  EXPECT_NE(Form2->GetRoot()->FindComponent("Edit1"), nullptr);
  DialogScript().Answer(mrYes);
  KilnRoot(Form2)->Command(dmRevert);
  EXPECT_EQ(Form2->GetRoot()->FindComponent("Edit1"), nullptr);
}

} // namespace
