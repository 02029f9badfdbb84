//===- desktop/DockToolForm.h - Dockable tool windows with a tool bar ----===//
//
// `TDockableToolbarForm` is a dockable form with a tool bar along its top,
// commands that show or hide the bar and its button captions, and the two
// settings kept in the host's settings file under the form's section.
//
// Example:
//   auto* Window = CreateComponentOf<TMyToolWindow>(Application());
//   Window->SetDeskSection("Watches");
//   Window->TextLabelsCmd()->Execute();   // [Watches] TextLabels=1 written at once
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/DockForm.h"

namespace formkit {

/// A dockable form with a tool bar and its two commands.
class FK_API TDockableToolbarForm : public TDockableForm {
  FK_CLASS(TDockableToolbarForm, TDockableForm)
public:
  /// Makes the bar, the commands and the menus, then reads the bar's state.
  void Create(TComponent* AOwner) override;

  /// The bar along the top, 30 high; owned by the form.
  TToolBar* ToolBar() const noexcept { return FToolBar; }
  TAction* ToolbarCmd() const noexcept { return FToolbarCmd; }
  TAction* TextLabelsCmd() const noexcept { return FTextLabelsCmd; }
  /// The bar's menu, and the form's own; owned by the form.
  TPopupMenu* ToolbarPopupMenu() const noexcept { return FToolbarPopupMenu; }
  TPopupMenu* FormPopupMenu() const noexcept { return FFormPopupMenu; }

  /// "Toolbar" (default True) and "TextLabels" (default the captions shown now) from
  /// the section of the host's settings file.
  virtual void LoadToolbarState();
  /// Writes both keys.
  virtual void SaveToolbarState();
  bool GetShowCaptions() const { return FToolBar->ShowCaptions(); }
  void SetShowCaptions(bool AValue);
  void ToolbarCmdExecute(TObject* Sender);
  void TextLabelsCmdExecute(TObject* Sender);

  void LoadWindowState(TCustomIniFile* ADesktop) override;
  void SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) override;

private:
  /// The host's settings file, or null when the host has none.
  static TCustomIniFile* Settings();
  TToolBar* FToolBar = nullptr;
  TAction* FToolbarCmd = nullptr;
  TAction* FTextLabelsCmd = nullptr;
  TPopupMenu* FToolbarPopupMenu = nullptr;
  TPopupMenu* FFormPopupMenu = nullptr;
};

} // namespace formkit
