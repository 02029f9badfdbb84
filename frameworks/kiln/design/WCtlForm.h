//===- frameworks/kiln/design/WCtlForm.h - The window around a control module ===//
//
// A module whose root is a bare windowed control (a frame) is designed in
// `TWinControlForm`. Without sizing the window hugs the control and the control
// follows the window; with sizing (a custom module with `cmaVirtualSize`) the
// window scrolls and three small handles at the control's right edge, bottom
// edge and corner resize the control alone.
//
// Example:
//   TWinControlForm* Window = TWinControlForm::CreateFor(Designer, /*Sizing=*/true);
//   Window->Initialize(Frame, true);          // the designer's opening does this
//   Window->DragStart(3, 100, 100);           // the corner handle
//   Window->DragMove(150, 120);               // the frame grows by 50 by 20
//   Window->DragEnd();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/design/DMForm.h"

#include <array>

namespace formkit {

namespace WCtlForm {
/// Set by the host: makes the design window of a control module when the designer asks
/// through `ICustomDesignForm80`; unset, the outputs stay null.
FK_API extern TCreateDesignerFormProc CreateDesignerFormProc;
} // namespace WCtlForm

/// The tag bit of a sizing handle that moves the right edge.
inline constexpr int SizerWidthBit = 1;
/// The tag bit of a sizing handle that moves the bottom edge.
inline constexpr int SizerHeightBit = 2;

/// The design window of a control module: position 8, 8, client size 435 by 266, tag
/// 93 until the control arrives.
class FK_API TWinControlForm : public TForm, public IInternalComponentContainerParent, public IDesignNotification {
  FK_CLASS(TWinControlForm, TForm)
  FK_INTERFACES(IInternalComponentContainerParent, IDesignNotification)

  /// Makes the window for the module on `Designer`; the caller frees it.
  [[nodiscard]] static TWinControlForm* CreateFor(const IPtr<IDesigner>& Designer, bool Sizing);
  void AfterConstruction() override;
  void BeforeDestruction() override;

  /// The handles: "WidthHandle" (tag 1), "SizeHandle" (tag 3) and "HeightHandle" (tag 2),
  /// black shapes owned by the window.
  TShape* WidthHandle() const noexcept { return FWidthHandle; }
  TShape* SizeHandle() const noexcept { return FSizeHandle; }
  TShape* HeightHandle() const noexcept { return FHeightHandle; }
  /// The handle of a tag from 1 to 3, once `Initialize` found it; null otherwise.
  TShape* Sizer(int Tag) const noexcept { return Tag >= 1 && Tag <= 3 ? FSizers[Tag - 1] : nullptr; }
  TWinControl* Control() const noexcept { return FControl; }
  bool Sizing() const noexcept { return FSizing; }
  int DragTag() const noexcept { return FDragTag; }

  /// Takes `Control` (not owned; it is inserted into the window's components) into the
  /// window and shows the handles when `Sizing`.
  void Initialize(TWinControl* Control, bool Sizing);
  /// Brings the window and the handles into line with the control, and the caption.
  void Modified();
  /// Without sizing, the control takes the client area's size (not while the window is
  /// following the control).
  void FormResize(TObject* Sender);
  /// Places each handle at its edge of the control, 5 by 5; hidden without sizing.
  void UpdateSizers();

  // Dragging a handle, in the window's client coordinates --------------------------------
  void DragStart(int Tag, int X, int Y);
  void DragMove(int X, int Y);
  void DragEnd();
  /// The handles' mouse events, in the handle's coordinates.
  void SizerMouseDown(TObject* Sender, TMouseButton Button, TShiftState Shift, int X, int Y);
  void SizerMouseMove(TObject* Sender, TShiftState Shift, int X, int Y);
  void SizerMouseUp(TObject* Sender, TMouseButton Button, TShiftState Shift, int X, int Y);

  void FocusContainer() override;

  // IDesignNotification -----------------------------------------------------------------
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override {}
  /// `Modified`, for any designer.
  void ItemsModified(const IPtr<IDesigner>& ADesigner) override;
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}
  /// `Initialize` with the root of its own designer.
  void DesignerOpened(const IPtr<IDesigner>& ADesigner, bool AResurrecting) override;
  void DesignerClosed(const IPtr<IDesigner>&, bool) override {}

protected:
  /// The control keeps the bounds it was given.
  void AlignControls() override {}
  void Resized() override;

private:
  /// The form point of a point of a handle, through the screen.
  TPoint FormPoint(TObject* Sender, int X, int Y) const;
  TShape* FWidthHandle = nullptr;  // owned by the window as a component
  TShape* FSizeHandle = nullptr;   // owned by the window as a component
  TShape* FHeightHandle = nullptr; // owned by the window as a component
  std::array<TShape*, 3> FSizers{};
  TWinControl* FControl = nullptr; // not owned: the designed root
  IPtr<IDesigner> FDesigner;
  bool FSizing = false;
  /// While the window is brought into line with the control, its own resizing must not
  /// size the control: a window that stands where no one sees it reports every change.
  bool FFollowingControl = false;
  int FDragTag = 0;
  TPoint FStartPoint;
  TPoint FStartSize;
};

/// The custom module of control modules: a `TWinControlForm` around the root, sizing
/// when the module's attributes have `cmaVirtualSize`.
class FK_API TWinControlCustomModule : public TCustomModule, public ICustomDesignForm, public ICustomDesignForm80 {
  FK_CLASS(TWinControlCustomModule, TCustomModule)
  FK_INTERFACES(ICustomDesignForm, ICustomDesignForm80)

  /// The window; the container is `Root` itself, parented in the window.
  void CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root, TCustomForm*& DesignForm,
                          TWinControl*& ComponentContainer) override;
  /// Clears both, then asks `WCtlForm::CreateDesignerFormProc` when the host set it.
  void CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root, IPtr<IHostForm>& DesignForm,
                          TWinControl*& ComponentContainer) override;
};

} // namespace formkit
