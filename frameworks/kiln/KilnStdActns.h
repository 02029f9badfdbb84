//===- frameworks/kiln/KilnStdActns.h - The framework's standard actions --===//
//
// Ready-made actions of the category "Edit" that work on an edit control:
// cut, copy and paste through the clipboard, and delete. Each works on the
// edit it is given as `Control`; without one it does nothing. The prototypes
// that give a new standard action its caption, hint and shortcut stand in one
// resource component, `TStandardActions`, one action of each class.
//
// Example:
//   auto* Copy = CreateComponentOf<TEditCopy>(Form);
//   Copy->SetControl(Edit1);
//   Copy->Execute();                 // the edit's text is on the clipboard
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnActions.h"
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// Edit actions
//===----------------------------------------------------------------------===//

/// An action on an edit control; the edit is not owned and is dropped when it goes.
class FK_API TEditControlAction : public TAction {
  FK_CLASS(TEditControlAction, TAction)
  void BeforeDestruction() override;

  TEdit* Control() const noexcept { return FControl; }
  void SetControl(TEdit* Value);
  /// Runs `OnExecute` if there is one, else acts on the edit; false without either.
  bool Execute() override;
  void Notification(TComponent* AComponent, TOperation Operation) override;

protected:
  /// What the action does to `Edit`.
  virtual void ExecuteTarget(TEdit* Edit) = 0;

private:
  TEdit* FControl = nullptr;
};

/// Puts the edit's text on the clipboard and empties the edit (unless it is read-only).
class FK_API TEditCut : public TEditControlAction {
  FK_CLASS(TEditCut, TEditControlAction)

protected:
  void ExecuteTarget(TEdit* Edit) override;
};

/// Puts the edit's text on the clipboard.
class FK_API TEditCopy : public TEditControlAction {
  FK_CLASS(TEditCopy, TEditControlAction)

protected:
  void ExecuteTarget(TEdit* Edit) override;
};

/// Replaces the edit's text with the clipboard's (unless it is read-only).
class FK_API TEditPaste : public TEditControlAction {
  FK_CLASS(TEditPaste, TEditControlAction)

protected:
  void ExecuteTarget(TEdit* Edit) override;
};

/// Empties the edit (unless it is read-only).
class FK_API TEditDelete : public TEditControlAction {
  FK_CLASS(TEditDelete, TEditControlAction)

protected:
  void ExecuteTarget(TEdit* Edit) override;
};

//===----------------------------------------------------------------------===//
// Prototypes
//===----------------------------------------------------------------------===//

/// The prototypes of the standard actions: one of each class, named after it
/// ("EditCut1", ...), with the caption, hint, shortcut and category a new one takes.
class FK_API TStandardActions : public TComponent {
  FK_CLASS(TStandardActions, TComponent)
  void Create(TComponent* AOwner) override;
};

/// The standard action classes, in the order they are registered.
[[nodiscard]] FK_API std::vector<TClass> StandardActionClasses();

} // namespace formkit
