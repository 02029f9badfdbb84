//===- frameworks/kiln/Kiln.cpp - Starting and stopping the framework ----===//
#include "frameworks/kiln/Kiln.h"

#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnDockTabs.h"
#include "frameworks/kiln/KilnMemo.h"
#include "frameworks/kiln/KilnPictures.h"
#include "frameworks/kiln/KilnSplitters.h"
#include "frameworks/kiln/KilnToolBars.h"
#include "frameworks/kiln/KilnValEdit.h"

namespace formkit {

namespace {
int KilnStarts = 0;
TClass GroupBeforeKiln = nullptr;

std::vector<TClass> KilnClasses() {
  return {TControl::StaticClass(),     TWinControl::StaticClass(), TGraphicControl::StaticClass(),
          TCustomControl::StaticClass(), TCustomForm::StaticClass(), TForm::StaticClass(),
          TCustomFrame::StaticClass(), TFrame::StaticClass(),      TDataModule::StaticClass(),
          TButton::StaticClass(),      TLabel::StaticClass(),      TEdit::StaticClass(),
          TCheckBox::StaticClass(),    TPanel::StaticClass(),      TTimer::StaticClass(),
          TStatusBar::StaticClass(),   TToolBar::StaticClass(),    TSplitter::StaticClass(),
          TDockTabSet::StaticClass(),  TScrollBox::StaticClass(),  TShape::StaticClass(),
          TMemo::StaticClass(),        TImage::StaticClass(),      TPaintBox::StaticClass(),
          TAction::StaticClass(),      TActionList::StaticClass(), TValueListEditor::StaticClass()};
}
} // namespace

void InitializeKiln() {
  if (KilnStarts++ > 0) return;
  auto Undo = OnFailure([]() noexcept {
    for (TClass C : KilnClasses()) UnRegisterClass(C);
    --KilnStarts;
  });
  // The group first: a class joins the group it belongs to when it is registered.
  StartClassGroup(TControl::StaticClass());
  GroupDescendentsWith(TDataModule::StaticClass(), TControl::StaticClass());
  GroupDescendentsWith(TTimer::StaticClass(), TControl::StaticClass());
  for (TClass C : KilnClasses()) RegisterClass(C);
  GroupBeforeKiln = ActivateClassGroup(TControl::StaticClass());
}

void FinalizeKiln() {
  if (KilnStarts == 0 || --KilnStarts > 0) return;
  for (TClass C : KilnClasses()) UnRegisterClass(C);
  if (GroupBeforeKiln) ActivateClassGroup(GroupBeforeKiln);
  GroupBeforeKiln = nullptr;
  detail::FreeClipboard();
  detail::FreeApplication();
  if (Screen()->FormCount() == 0) detail::FreeScreen();
}

bool KilnInitialized() noexcept { return KilnStarts > 0; }

std::vector<TClass> KilnPaletteClasses() {
  return {TButton::StaticClass(),    TLabel::StaticClass(),     TEdit::StaticClass(),
          TMemo::StaticClass(),      TCheckBox::StaticClass(),  TPanel::StaticClass(),
          TScrollBox::StaticClass(), TShape::StaticClass(),     TImage::StaticClass(),
          TPaintBox::StaticClass(),  TSplitter::StaticClass(),  TStatusBar::StaticClass(),
          TToolBar::StaticClass(),   TDockTabSet::StaticClass(), TValueListEditor::StaticClass(),
          TTimer::StaticClass(),     TActionList::StaticClass()};
}

} // namespace formkit
