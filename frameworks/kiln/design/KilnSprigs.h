//===- frameworks/kiln/design/KilnSprigs.h - Kiln's structure tree nodes -===//
//
// The sprigs that give the structure tree Kiln's rules: a control moves in the
// tree by taking a new parent control, it may only go into a control that
// accepts controls, non-visual components stay directly under the root, a data
// module takes no controls, and a frame shows the components it owns. The
// package registers them when it loads (`RegisterKilnSprigs`).
//
// Example:
//   RegisterKilnSprigs();                       // what the package does
//   TSprig* PanelSprig = Root->Find(Panel1);   // a TWinControlSprig
//   PanelSprig->DragDrop(Root->Find(Button1));  // Button1 now sits on Panel1
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"
#include "tree/RootSprig.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// Sprigs of controls
//===----------------------------------------------------------------------===//

/// The sprig of a control. Its drag and palette tests say whether it may go under a
/// sprig: only under a control's sprig (or a windowed root) whose control accepts
/// controls. Does not own its control.
class FK_API TControlSprig : public TComponentSprig {
  FK_CLASS(TControlSprig, TComponentSprig)
  TControlSprig() = default;
  using inherited::Create;
  void Create(TPersistent* AItem) override;
  bool DragOverTo(TSprig* AParent) override;
  /// The same test as `DragOverTo`; the move itself is the target's (`DragDrop`).
  bool DragDropTo(TSprig* AParent) override;
  /// The same test; a class operation.
  bool PaletteOverTo(TSprig* AParent, TClass AClass) override;
};

/// The sprig of a windowed control: takes controls of the same owner by re-parenting
/// them, kept inside its client area. Its image says whether it accepts controls.
class FK_API TWinControlSprig : public TControlSprig {
  FK_CLASS(TWinControlSprig, TControlSprig)
  TWinControlSprig() = default;
  using inherited::Create;
  void Create(TPersistent* AItem) override;
  bool DragOver(TSprig* AItem) override;
  /// Re-parents `AItem`'s control to this sprig's; false when it is already the parent,
  /// the owners differ or `AItem` is no control's sprig. Raises what the control's parent
  /// setter raises (a control dropped into its own child), with nothing changed.
  bool DragDrop(TSprig* AItem) override;
  bool PaletteOver(TSprigClass ASprigClass, TClass AClass) override;
};

/// The sprig of a frame nested in a module: shows the components the frame owns, which
/// the root's own walk does not meet.
class FK_API TFrameSprig : public TWinControlSprig {
  FK_CLASS(TFrameSprig, TWinControlSprig)
  TFrameSprig() = default;
  using inherited::Create;
  void Create(TPersistent* AItem) override;
  /// The collections, then a sprig for each owned component the tree has none for, in
  /// the order of the frame's components. Cost: one index search per owned component.
  void FigureChildren() override;
};

//===----------------------------------------------------------------------===//
// Root sprigs
//===----------------------------------------------------------------------===//

/// The root of a module whose root component is a windowed control: takes its controls
/// as a windowed control's sprig does, and any non-visual component.
class FK_API TWinControlRootSprig : public TRootSprig {
  FK_CLASS(TWinControlRootSprig, TRootSprig)
  TWinControlRootSprig() = default;
  void Create(TPersistent* AItem) override;
  bool DragOver(TSprig* AItem) override;
  /// A control of this module is re-parented to the root control; any other component's
  /// sprig goes the default way. Raises as `TWinControlSprig::DragDrop`.
  bool DragDrop(TSprig* AItem) override;
  bool PaletteOver(TSprigClass ASprigClass, TClass AClass) override;
};

/// The root of a form module.
class FK_API TCustomFormRootSprig : public TWinControlRootSprig {
  FK_CLASS(TCustomFormRootSprig, TWinControlRootSprig)
  TCustomFormRootSprig() = default;
  void Create(TPersistent* AItem) override;
};

/// The root of a data module: non-visual components only.
class FK_API TDataModuleRootSprig : public TRootSprig {
  FK_CLASS(TDataModuleRootSprig, TRootSprig)
  TDataModuleRootSprig() = default;
  void Create(TPersistent* AItem) override;
  bool AcceptsClass(TClass AClass) override;
  bool DragOver(TSprig* AItem) override;
  bool PaletteOver(TSprigClass ASprigClass, TClass AClass) override;
};

//===----------------------------------------------------------------------===//
// Images and registration
//===----------------------------------------------------------------------===//

/// The images of the framework's sprigs in the tree's image strip; a windowed control
/// shows `CUIControlImageIndex[accepts controls]`.
inline constexpr int SprigImageDataModule = 5;
inline constexpr int SprigImageControl = 6;
inline constexpr int SprigImageForm = 9;

/// Registers the six sprig classes for the framework's classes under the current
/// package group: controls, windowed controls and frames; windowed, form and data module
/// roots.
FK_API void RegisterKilnSprigs();

} // namespace formkit
