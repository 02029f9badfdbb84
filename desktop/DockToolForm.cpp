//===- desktop/DockToolForm.cpp - Dockable tool windows with a tool bar --===//
#include "desktop/DockToolForm.h"

namespace formkit {

namespace {
constexpr const char* KeyToolbar = "Toolbar";
constexpr const char* KeyTextLabels = "TextLabels";
constexpr int ToolbarHeight = 30;

TPopupMenu* MenuWith(TComponent* Owner, const char* Name, std::initializer_list<TAction*> Actions) {
  auto* Menu = CreateComponentOf<TPopupMenu>(Owner);
  Menu->SetName(Name);
  for (TAction* A : Actions) {
    auto* Item = CreateComponentOf<TMenuItem>(Owner);
    Item->SetAction(A);
    Menu->Items()->Add(Item);
  }
  return Menu;
}
} // namespace

FK_IMPLEMENT(TDockableToolbarForm, "DockToolForm") {}

TCustomIniFile* TDockableToolbarForm::Settings() { return IDEIniFile ? IDEIniFile() : nullptr; }

void TDockableToolbarForm::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FToolBar = CreateComponentOf<TToolBar>(this);
  FToolBar->SetName("ToolBar");
  FToolBar->SetParent(this);
  FToolBar->SetHeight(ToolbarHeight);
  FToolbarCmd = CreateComponentOf<TAction>(this);
  FToolbarCmd->SetName("ToolbarCmd");
  FToolbarCmd->SetCaption("&Toolbar");
  FToolbarCmd->SetChecked(true);
  FToolbarCmd->SetActionList(DockActionList());
  FToolbarCmd->OnExecute = TNotifyEvent::Bind<&TDockableToolbarForm::ToolbarCmdExecute>(this);
  FTextLabelsCmd = CreateComponentOf<TAction>(this);
  FTextLabelsCmd->SetName("TextLabelsCmd");
  FTextLabelsCmd->SetCaption("Text &Labels");
  FTextLabelsCmd->SetActionList(DockActionList());
  FTextLabelsCmd->OnExecute = TNotifyEvent::Bind<&TDockableToolbarForm::TextLabelsCmdExecute>(this);
  FToolbarPopupMenu = MenuWith(this, "ToolbarPopupMenu", {FToolbarCmd, FTextLabelsCmd});
  FFormPopupMenu = MenuWith(this, "FormPopupMenu", {DockableCmd(), StayOnTopCmd(), FToolbarCmd});
  SetPopupMenu(FFormPopupMenu);
  LoadToolbarState();
}

void TDockableToolbarForm::SetShowCaptions(bool AValue) {
  SetShowCaptionsToolBar(this, FToolBar, AValue);
  FTextLabelsCmd->SetChecked(AValue);
}

void TDockableToolbarForm::LoadToolbarState() {
  TCustomIniFile* Ini = Settings();
  if (!Ini || DeskSection().empty()) return;
  bool Shown = Ini->ReadBool(DeskSection(), KeyToolbar, true);
  FToolBar->SetVisible(Shown);
  FToolbarCmd->SetChecked(Shown);
  SetShowCaptions(Ini->ReadBool(DeskSection(), KeyTextLabels, GetShowCaptions()));
}

void TDockableToolbarForm::SaveToolbarState() {
  TCustomIniFile* Ini = Settings();
  if (!Ini || DeskSection().empty()) return;
  Ini->WriteBool(DeskSection(), KeyToolbar, FToolBar->Visible());
  Ini->WriteBool(DeskSection(), KeyTextLabels, GetShowCaptions());
}

void TDockableToolbarForm::ToolbarCmdExecute(TObject*) {
  bool Shown = !FToolBar->Visible();
  FToolBar->SetVisible(Shown);
  FToolbarCmd->SetChecked(Shown);
  if (TCustomIniFile* Ini = Settings(); Ini && !DeskSection().empty()) Ini->WriteBool(DeskSection(), KeyToolbar, Shown);
}

void TDockableToolbarForm::TextLabelsCmdExecute(TObject*) {
  bool Show = !GetShowCaptions();
  SetShowCaptions(Show);
  if (TCustomIniFile* Ini = Settings(); Ini && !DeskSection().empty()) Ini->WriteBool(DeskSection(), KeyTextLabels, Show);
}

void TDockableToolbarForm::LoadWindowState(TCustomIniFile* ADesktop) {
  inherited::LoadWindowState(ADesktop);
  LoadToolbarState();
}

void TDockableToolbarForm::SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) {
  inherited::SaveWindowState(ADesktop, AIsProject);
  SaveToolbarState();
}

} // namespace formkit
