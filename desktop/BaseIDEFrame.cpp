//===- desktop/BaseIDEFrame.cpp - Frames of the environment's windows ----===//
#include "desktop/BaseIDEFrame.h"

#include "desktop/DeskForm.h"

namespace formkit {

FK_IMPLEMENT(TBaseFrame, "BaseIDEFrame") {}

IEditHandler* FindFocusedEditHandler(TWinControl* Root) {
  TControl* C = GetFocus();
  if (!C || !C->HasAncestor(Root)) return nullptr;
  while (C && !dynamic_cast<TDesktopForm*>(C) && !dynamic_cast<TBaseFrame*>(C)) C = C->Parent();
  if (!C || C == Root) return nullptr;
  return static_cast<IEditHandler*>(C->GetInterfaceEntry(IEditHandler::IID));
}

bool TBaseFrame::EditAction(TEditAction AAction) {
  IEditHandler* H = FindFocusedEditHandler(this);
  return H && H->EditAction(AAction);
}

TEditState TBaseFrame::GetEditState() {
  IEditHandler* H = FindFocusedEditHandler(this);
  return H ? H->GetEditState() : TEditState::FromMask(AllEditStates);
}

} // namespace formkit
