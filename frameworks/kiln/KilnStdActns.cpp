//===- frameworks/kiln/KilnStdActns.cpp - The framework's standard actions ===//
#include "frameworks/kiln/KilnStdActns.h"

#include "frameworks/kiln/KilnClipbrd.h"

namespace formkit {

namespace {

/// A shortcut of Ctrl with a letter key.
constexpr int CtrlKey(char Letter) { return 0x4000 | Letter; }
/// The Delete key.
constexpr int VkDelete = 0x2E;

template <class T>
void AddPrototype(TComponent* Owner, const char* Name, const char* Caption, const char* Hint, int ShortCut) {
  T* Action = CreateComponentOf<T>(Owner);
  Action->SetName(Name);
  Action->SetCategory("Edit");
  Action->SetCaption(Caption);
  Action->SetHint(Hint);
  Action->SetShortCut(ShortCut);
}

} // namespace

//===----------------------------------------------------------------------===//
// Edit actions
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TEditControlAction, "KilnStdActns") {}

void TEditControlAction::BeforeDestruction() {
  SetControl(nullptr);
  inherited::BeforeDestruction();
}

void TEditControlAction::SetControl(TEdit* Value) {
  if (Value == FControl) return;
  if (FControl) RemoveFreeNotification(FControl);
  FControl = Value;
  if (Value) FreeNotification(Value);
}

bool TEditControlAction::Execute() {
  if (!Enabled()) return false;
  if (OnExecute) return inherited::Execute();
  if (!FControl) return false;
  ExecuteTarget(FControl);
  return true;
}

void TEditControlAction::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation == opRemove && AComponent == FControl) FControl = nullptr;
}

FK_IMPLEMENT(TEditCut, "KilnStdActns") {}

void TEditCut::ExecuteTarget(TEdit* Edit) {
  Clipboard()->SetAsText(Edit->Text());
  if (!Edit->ReadOnly()) Edit->SetText(String());
}

FK_IMPLEMENT(TEditCopy, "KilnStdActns") {}

void TEditCopy::ExecuteTarget(TEdit* Edit) { Clipboard()->SetAsText(Edit->Text()); }

FK_IMPLEMENT(TEditPaste, "KilnStdActns") {}

void TEditPaste::ExecuteTarget(TEdit* Edit) {
  if (!Edit->ReadOnly()) Edit->SetText(Clipboard()->AsText());
}

FK_IMPLEMENT(TEditDelete, "KilnStdActns") {}

void TEditDelete::ExecuteTarget(TEdit* Edit) {
  if (!Edit->ReadOnly()) Edit->SetText(String());
}

//===----------------------------------------------------------------------===//
// Prototypes
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStandardActions, "KilnStdActns") {}

void TStandardActions::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  AddPrototype<TEditCut>(this, "EditCut1", "Cu&t", "Cut|Cuts the text and puts it on the Clipboard", CtrlKey('X'));
  AddPrototype<TEditCopy>(this, "EditCopy1", "&Copy", "Copy|Copies the text and puts it on the Clipboard",
                          CtrlKey('C'));
  AddPrototype<TEditPaste>(this, "EditPaste1", "&Paste", "Paste|Inserts the Clipboard contents", CtrlKey('V'));
  AddPrototype<TEditDelete>(this, "EditDelete1", "&Delete", "Delete|Erases the text", VkDelete);
}

std::vector<TClass> StandardActionClasses() {
  return {TEditCut::StaticClass(), TEditCopy::StaticClass(), TEditPaste::StaticClass(), TEditDelete::StaticClass()};
}

} // namespace formkit
