//===- desktop/BaseIDEFrame.h - Frames of the environment's windows ------===//
//
// `TBaseFrame` is the frame counterpart of a desktop window: a part of a
// window with its own section name and its own edit commands. A desktop window
// hands an edit to the innermost frame around the focused control.
//
// Example:
//   class TSearchFrame : public TBaseFrame { ... bool EditAction(TEditAction A) override; };
//   Window->EditAction(eaCopy);   // reaches the frame when its edit has the focus
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"
#include "desktop/DeskUtil.h"

namespace formkit {

/// A frame of an environment window.
class FK_API TBaseFrame : public TFrame, public IEditHandler {
  FK_CLASS(TBaseFrame, TFrame)
  FK_INTERFACES(IEditHandler)

  const String& DeskSection() const noexcept { return FDeskSection; }
  void SetDeskSection(const String& Value) { FDeskSection = Value; }
  bool LoadedFromDesktop() const noexcept { return FLoadedFromDesktop; }
  void SetLoadedFromDesktop(bool Value) noexcept { FLoadedFromDesktop = Value; }

  /// Nothing by default: a frame that keeps state overrides them.
  virtual void LoadWindowState(TCustomIniFile*) {}
  virtual void SaveWindowState(TCustomIniFile*, bool) {}
  /// Passes the edit to the innermost desktop window or frame of the focus inside this
  /// frame; false when that is this frame or none.
  bool EditAction(TEditAction AAction) override;
  TEditState GetEditState() override;
  virtual void DoMainFormShown() {}

private:
  String FDeskSection;
  bool FLoadedFromDesktop = false;
};

/// The innermost desktop window or frame around the focused control of `Root`, as its
/// edit handler; null when the focus is outside `Root`, or when that is `Root` itself.
FK_API IEditHandler* FindFocusedEditHandler(TWinControl* Root);

} // namespace formkit
