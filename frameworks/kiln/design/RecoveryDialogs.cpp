//===- frameworks/kiln/design/RecoveryDialogs.cpp - Asking the user about a broken module ===//
#include "frameworks/kiln/design/RecoveryDialogs.h"

#include "core/Designers.h"
#include "frameworks/kiln/KilnWindows.h"
#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

namespace formkit {

namespace {

/// Places a form of client size `Width` by `Height` with a dialog's frame in the middle of
/// the screen's work area.
void CentreDialog(TCustomForm* Form, int Width, int Height) {
  Form->SetBorderStyle(bsDialog);
  Form->SetPosition(poScreenCenter);
  Form->SetClientWidth(Width);
  Form->SetClientHeight(Height);
  TRect Work = Screen()->WorkAreaRect();
  Form->SetBounds(Work.Left + (Work.Width() - Form->Width()) / 2, Work.Top + (Work.Height() - Form->Height()) / 2,
                  Form->Width(), Form->Height());
}

/// A control of class `T` named `Name` in `Parent`, owned by `Form`, at `Rect`.
template <class T> T* Place(TCustomForm* Form, TWinControl* Parent, const char* Name, const TRect& Rect) {
  T* Control = CreateComponentOf<T>(Form);
  Control->SetName(Name);
  Control->SetParent(Parent);
  Control->SetBoundsRect(Rect);
  return Control;
}

TButton* PlaceButton(TCustomForm* Form, TWinControl* Parent, const char* Name, const char* Caption, const TRect& Rect,
                     TModalResult Result) {
  auto* Button = Place<TButton>(Form, Parent, Name, Rect);
  Button->SetCaption(Caption);
  Button->SetModalResult(Result);
  return Button;
}

/// The dialog, freed on the way out whatever happens.
template <class T> TObjectGuard<T> NewDialog() { return TObjectGuard<T>(CreateComponentOf<T>(nullptr)); }

} // namespace

//===----------------------------------------------------------------------===//
// TIDEWaitDialog
//===----------------------------------------------------------------------===//

void TIDEWaitDialog::Show() {
  FShowing = true;
  if (OnShowingChanged) OnShowingChanged(true);
}

void TIDEWaitDialog::Hide() {
  FShowing = false;
  if (OnShowingChanged) OnShowingChanged(false);
}

//===----------------------------------------------------------------------===//
// Ancestor component not found
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TRecoverFormInheritence, "RecoveryDialogs") {}

void TRecoverFormInheritence::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("RecoverFormInheritence");
  SetCaption("Ancestor Component Not Found");
  CentreDialog(this, 309, 193);
  MessageLbl = Place<TLabel>(this, this, "MessageLbl", Bounds(6, 6, 297, 49));
  MessageLbl->SetWordWrap(true);
  MessageLbl->SetCaption("Modifications to component %s were recorded in form %s but the ancestor component was not "
                         "found in form %s.");
  GroupBox1 = Place<TPanel>(this, this, "GroupBox1", Bounds(6, 58, 297, 97));
  GroupBox1->SetCaption(String());
  DeletedCheck = Place<TRadioButton>(this, GroupBox1, "DeletedCheck", Bounds(8, 6, 281, 17));
  DeletedCheck->SetCaption("Component was deleted, delete reference.");
  RenamedCheck = Place<TRadioButton>(this, GroupBox1, "RenamedCheck", Bounds(8, 27, 281, 17));
  RenamedCheck->SetCaption("Component was renamed to:");
  RenameText = Place<TComboBox>(this, GroupBox1, "RenameText", Bounds(24, 48, 265, 23));
  RenameText->SetStyle(csDropDownList);
  CreateCheck = Place<TRadioButton>(this, GroupBox1, "CreateCheck", Bounds(8, 75, 281, 17));
  CreateCheck->SetCaption("Create component as new on the descendent.");
  DeletedCheck->SetTabOrder(0);
  RenamedCheck->SetTabOrder(1);
  RenameText->SetTabOrder(2);
  CreateCheck->SetTabOrder(3);
  for (TRadioButton* Option : {DeletedCheck, RenamedCheck, CreateCheck})
    Option->OnClick = TNotifyEvent::Bind<&TRecoverFormInheritence::OptionsChanged>(this);
  OKBtn = PlaceButton(this, this, "OKBtn", "OK", Bounds(146, 162, 75, 25), mrOk);
  OKBtn->SetDefault(true);
  CancelBtn = PlaceButton(this, this, "CancelBtn", "Cancel", Bounds(228, 162, 75, 25), mrCancel);
  CancelBtn->SetCancel(true);
}

void TRecoverFormInheritence::Setup(const String& FormName, const String& AncestorName, const String& ComponentName,
                                    const String& Candidates, bool Nested) {
  RenameText->Items()->SetCommaText(Candidates);
  RenameText->SetEnabled(false);
  RenamedCheck->SetEnabled(!Candidates.empty());
  if (!Candidates.empty() && RenameText->Items()->Count() > 0) RenameText->SetItemIndex(0);
  DeletedCheck->SetChecked(true);
  CreateCheck->SetVisible(!Nested);
  MessageLbl->SetCaption(Format(MessageLbl->Caption(), ComponentName, FormName, AncestorName));
}

void TRecoverFormInheritence::OptionsChanged(TObject*) {
  RenameText->SetEnabled(RenamedCheck->Checked());
  if (RenameText->Enabled()) SetActiveControl(RenameText);
}

TRecoveryResult FormInheritenceRecovery(const String& FormName, const String& AncestorName, String& ComponentName,
                                        const String& Candidates, bool Nested) {
  auto Dialog = NewDialog<TRecoverFormInheritence>();
  Dialog->Setup(FormName, AncestorName, ComponentName, Candidates, Nested);
  TRecoveryResult Result = rrCancel;
  if (ShowModal(Dialog.Get()) == mrOk) {
    if (Dialog->DeletedCheck->Checked()) {
      Result = rrDelete;
    } else if (Dialog->RenamedCheck->Checked()) {
      Result = rrRename;
      ComponentName = Dialog->RenameText->Text();
    } else if (Dialog->CreateCheck->Checked()) {
      Result = rrCreate;
    }
  }
  return Result;
}

//===----------------------------------------------------------------------===//
// Error reading form
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TReadErrorDlg, "RecoveryDialogs") {}

void TReadErrorDlg::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("ReadErrorDlg");
  SetCaption("Error Reading Form");
  Font()->SetName("Segoe UI");
  CentreDialog(this, 420, 150);
  pnButtons = Place<TPanel>(this, this, "pnButtons", Bounds(0, 109, 420, 41));
  pnButtons->SetCaption(String());
  pnButtons->SetAlign(alBottom);
  pnMain = Place<TPanel>(this, this, "pnMain", Bounds(0, 0, 420, 109));
  pnMain->SetCaption(String());
  pnMain->SetAlign(alClient);
  Bevel1 = Place<TBevel>(this, pnMain, "Bevel1", Bounds(8, 8, 404, 93));
  Label1 = Place<TLabel>(this, pnMain, "Label1", Bounds(16, 16, 388, 77));
  Label1->SetWordWrap(true);
  Label1->SetCaption("%s.  Ignore the error and continue?  NOTE: Ignoring the error may cause components to be "
                     "deleted or property values to be lost.");
  IgnoreButton = PlaceButton(this, pnButtons, "IgnoreButton", "&Ignore", Bounds(175, 8, 75, 25), mrOk);
  IgnoreAllButton = PlaceButton(this, pnButtons, "IgnoreAllButton", "Ignore &All", Bounds(256, 8, 75, 25), mrNone);
  IgnoreAllButton->OnClick = TNotifyEvent::Bind<&TReadErrorDlg::IgnoreAllClick>(this);
  CancelButton = PlaceButton(this, pnButtons, "CancelButton", "Cancel", Bounds(337, 8, 75, 25), mrCancel);
  CancelButton->SetCancel(true);
  OnShow = TNotifyEvent::Bind<&TReadErrorDlg::FormShow>(this);
}

void TReadErrorDlg::FormShow(TObject*) { SetActiveControl(IgnoreButton); }

void TReadErrorDlg::IgnoreAllClick(TObject*) { SetModalResult(mrIgnoreAll); }

int FormReadError(const String& Message, const String& ModuleName) {
  bool WaitWasShowing = TIDEWaitDialog::IsShowing();
  if (WaitWasShowing) TIDEWaitDialog::Hide();
  auto ShowWaitAgain = Finally([WaitWasShowing]() noexcept {
    if (WaitWasShowing) RunIgnoringExceptions([] { TIDEWaitDialog::Show(); });
  });
  auto Dialog = NewDialog<TReadErrorDlg>();
  if (!ModuleName.empty()) Dialog->SetCaption(Format(LoadResString(sReadErrorCaption), ModuleName));
  Dialog->Label1->SetCaption(Format(Dialog->Label1->Caption(), Message));
  return ShowModal(Dialog.Get());
}

//===----------------------------------------------------------------------===//
// Link redirection
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TLinkRedirect, "RecoveryDialogs") {}

void TLinkRedirect::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("LinkRedirect");
  SetCaption("Link Redirection");
  CentreDialog(this, 323, 226);
  Bevel1 = Place<TBevel>(this, this, "Bevel1", Bounds(8, 8, 307, 177));
  InfoLabel = Place<TLabel>(this, this, "InfoLabel", Bounds(16, 16, 291, 13));
  InfoLabel->SetCaption("Redirect form %s's links from %s to:");
  LinkNames = Place<TListBox>(this, this, "LinkNames", Bounds(16, 36, 291, 141));
  LinkNames->SetSorted(true);
  OKBtn = PlaceButton(this, this, "OKBtn", "OK", Bounds(78, 193, 75, 25), mrNone);
  OKBtn->SetDefault(true);
  OKBtn->OnClick = TNotifyEvent::Bind<&TLinkRedirect::OKBtnClick>(this);
  CancelBtn = PlaceButton(this, this, "CancelBtn", "Cancel", Bounds(159, 193, 75, 25), mrNone);
  CancelBtn->SetCancel(true);
  CancelBtn->OnClick = TNotifyEvent::Bind<&TLinkRedirect::CancelBtnClick>(this);
  HelpBtn = PlaceButton(this, this, "HelpBtn", "Help", Bounds(240, 193, 75, 25), mrNone);
}

void TLinkRedirect::OKBtnClick(TObject*) { SetModalResult(mrOk); }

void TLinkRedirect::CancelBtnClick(TObject*) { SetModalResult(mrCancel); }

namespace {

/// Whether the open module `Name` has a component of each of `Names`.
bool ModuleHolds(const IPtr<IComponentDesigner>& Designer, const String& Name, const std::vector<String>& Names) {
  IPtr<IRoot> Module = Designer ? Designer->FindRoot(Name) : nullptr;
  TComponent* Root = Module ? Module->GetRoot() : nullptr;
  if (!Root) return false;
  for (const String& Wanted : Names)
    if (!Root->FindComponent(Wanted)) return false;
  return true;
}

/// Fills the list with the open modules but `Root`'s own, behind "<Remove links>".
void FillTargets(TLinkRedirect& Dialog, const IPtr<IComponentDesigner>& Designer, TComponent* Root) {
  TStrings* Items = Dialog.LinkNames->Items();
  if (Designer) Designer->GetRootNames([Items](const String& Name) { Items->Add(Name); });
  if (int Own = Items->IndexOf(Root->Name()); Own >= 0) Items->Delete(Own);
  // The sorting is suspended, so the removal entry stands ahead of the names.
  Dialog.LinkNames->SetSorted(false);
  Items->Insert(0, LoadResString(SRemoveLinks));
}

} // namespace

void RedirectLinks(TComponent* Root, const String& ReferenceName) {
  auto Dialog = NewDialog<TLinkRedirect>();
  Dialog->InfoLabel->SetCaption(Format(Dialog->InfoLabel->Caption(), Root->Name(), ReferenceName));
  TObjectGuard<TCanvas> Measure(new TCanvas);
  Measure->Font()->Assign(Dialog->Font());
  int LabelWidth = Measure->TextWidth(Dialog->InfoLabel->Caption());
  if (Dialog->LinkNames->Width() < LabelWidth) {
    int Grow = LabelWidth - Dialog->LinkNames->Width();
    Dialog->SetWidth(Dialog->Width() + Grow);
    Dialog->LinkNames->SetWidth(Dialog->LinkNames->Width() + Grow);
  }
  IPtr<IComponentDesigner> Designer = ActiveDesigner();
  FillTargets(*Dialog.Get(), Designer, Root);
  std::vector<String> Expected;
  GetFixupInstanceNames(Root, ReferenceName, Expected);
  TStrings* Items = Dialog->LinkNames->Items();
  for (int I = 0; I < Items->Count(); ++I)
    if (ModuleHolds(Designer, Items->Get(I), Expected)) {
      Dialog->LinkNames->SetItemIndex(I);
      break;
    }
  if (ShowModal(Dialog.Get()) != mrOk) return;
  int Chosen = Dialog->LinkNames->ItemIndex();
  if (Chosen < 1) RemoveFixupReferences(Root, ReferenceName);
  else RedirectFixupReferences(Root, ReferenceName, Items->Get(Chosen));
}

} // namespace formkit
