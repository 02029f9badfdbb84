//===- frameworks/kiln/design/EditorFormDesigner.h - The frame in an editor page ===//
//
// `TEditorFormDesigner` is the frame the host puts in an editor page for the
// sub-view "Design". A framework's wrapper shows its designer in it and tells it
// the designer (`SetActiveDesigner`) and the control that takes the keys
// (`SetFocusedControl`); the frame then hands the keys typed into it to that
// form's designer hook, and its view selector adds, shows and removes the views
// of the module. When the designer is open in another window the frame offers a
// button to bring it back.
//
// Example:
//   auto* Frame = CreateComponentOf<TEditorFormDesigner>(Page);
//   Frame->SetActiveDesigner(Designer);   // a view's designer goes to its master
//   Frame->SetFocusedControl(DesignForm);
//   SendMessage(Frame, WM_KEYDOWN, 0x25, 0);   // Left: the form's designer hook gets it
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/design/ViewSelector.h"

#include "frameworks/kiln/KilnPictures.h"

namespace formkit {

struct IRoot;

FK_RESOURCESTRING(sDesignerInAnotherWindow,
                  "This form or frame is being designed in another window.\r\nDo you want to use the designer in "
                  "this window instead?");

/// The messages the frame takes part in.
enum : std::uint32_t {
  /// Asks a control which keys it wants; the frame answers `DLGC_WANTALL`.
  WM_GETDLGCODE = 0x0087,
  WM_KEYDOWN = 256,
  WM_KEYUP = 257,
  WM_CHAR = 258,
  WM_SYSKEYDOWN = 260,
  WM_SYSKEYUP = 261,
  WM_SYSCHAR = 262,
  /// Posted to the parent form: bring the designer back into this frame.
  UM_OPENDESIGNER = 1308,
  /// The editor page's frame became active, or stopped being; swallowed while a designed
  /// form has the keys.
  CM_EDITORACTIVATE = 45061,
  CM_EDITORDEACTIVATE = 45062,
  /// Asked of the application: a key typed with Alt, as a shortcut of the environment.
  CM_APPSYSKEYDOWN = 45078,
  /// The frame is to give the focus to its designed form.
  CM_EDITORFOCUS = 45082,
  /// A system key as the control notified of it receives it.
  CN_SYSKEYDOWN = 0xBC00 + WM_SYSKEYDOWN,
};

/// What `WM_GETDLGCODE` answers: arrows, tab and all keys.
inline constexpr std::intptr_t DLGC_WANTALL = 7;

/// The window of the environment that hears application messages; null: none, and
/// `SendAppMessage` answers 0. Not owned.
FK_API extern TMessageTarget* ApplicationMessageTarget;
/// Sends a message to `ApplicationMessageTarget` and gives its answer; 0 without one.
FK_API std::intptr_t SendAppMessage(std::uint32_t Msg, std::intptr_t WParam, std::intptr_t LParam);

/// What a package's install state tells the frame.
FK_ENUM(TPackageNotifyOperation, std::uint8_t, poInstalled, poUninstalled, poUninstalling)

/// The frame of the sub-view "Design": 700 by 300, the view selector on top.
class FK_API TEditorFormDesigner : public TFrame, public IDesignNotificationViews {
  FK_CLASS(TEditorFormDesigner, TFrame)
  FK_INTERFACES(IDesignNotificationViews)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// Shows `Designer`'s module (its master when it is a view) in the selector. Nothing
  /// for a designer that is no module on design.
  void SetActiveDesigner(const IPtr<IDesigner>& Designer);
  const IPtr<IDesigner>& ActiveDesigner() const noexcept { return FActiveDesigner; }
  /// Fills the style list again and selects `Family`.
  void SelectPreviewStyle(TOTAOSFamily Family);
  /// The control that takes the keys typed into the frame: the designed form. Not owned:
  /// it clears itself when that control goes.
  TWinControl* FocusedControl() const noexcept { return FFocusedControl; }
  void SetFocusedControl(TWinControl* Control);
  /// Whether the view selector shows.
  bool Multiview() const { return ViewSelector->Visible(); }
  void SetMultiview(bool Value) { ViewSelector->SetVisible(Value); }
  /// Gives the selector the views of the active designer's module.
  void UpdateViewSelector();
  /// A package was installed or removed: its devices' views come or go.
  void PackageNotification(const String& PackageName, TPackageNotifyOperation Operation);
  /// Centres the picture, the label and the button in `Rect` as one column.
  void FrameAlignPosition(const TRect& Rect);
  /// Posts `UM_OPENDESIGNER` to the parent form.
  void BtnOpenDesignerClick(TObject* Sender);

  // The selector's events -----------------------------------------------------------------
  void DoCheckView(TObject* Sender, const String& Name, bool& Allowed);
  void DoSelectView(TObject* Sender, const String& Name);
  void DoAddView(TObject* Sender, const String& Name);
  void DoRemoveView(TObject* Sender, const String& Name);
  void DoRotateView(TObject* Sender);
  void DoBackgroundView(TObject* Sender);
  void DoSelectStyle(TObject* Sender, TOTAOSFamily Family);

  // IDesignNotificationViews ---------------------------------------------------------------
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemsModified(const IPtr<IDesigner>&) override {}
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}
  void DesignerOpened(const IPtr<IDesigner>&, bool) override {}
  void DesignerClosed(const IPtr<IDesigner>&, bool) override {}
  void ViewAdded(const IPtr<IDesigner>& Designer, const String& ViewName) override;
  void ViewRemoved(const IPtr<IDesigner>& Designer, const String& ViewName) override;

  TViewSelectorFrame* ViewSelector = nullptr;
  TButton* BtnOpenDesigner = nullptr;
  TLabel* LbOpenDesigner = nullptr;
  TImage* VirtualImage1 = nullptr;

protected:
  void WndProc(TMessage& Message) override;
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  /// The master module of the active designer; null without one.
  [[nodiscard]] IPtr<IRoot> ActiveRoot() const;
  /// Selects the active view's name in the selector, or the master.
  void HighlightActiveView();
  /// The first of the active view's root and its parents that answers
  /// `IViewDesignSupport`; null when none does.
  [[nodiscard]] IPtr<IViewDesignSupport> FindViewSupport() const;
  /// Hands a key message to the focused form's designer hook; true when it took it.
  bool DispatchToDesigner(TMessage& Message);
  TWinControl* FFocusedControl = nullptr;
  IPtr<IDesigner> FActiveDesigner;
  bool FNotificationRegistered = false;
};

} // namespace formkit
