//===- frameworks/kiln/design/DialogState.h - Where dialogs keep their state ===//
//
// The dialog state service: an ini view on the registry below the host's base
// registry key, in which an editor's window keeps its bounds and options between
// sessions. Bounds and sizes may be kept at the default resolution, so that a
// window keeps its size on a monitor of another density.
//
// Example:
//   TIDEDialogRegistryServices State("Collection Editor\\TListColumns", false, Editor);
//   State.ReadFormBounds();                     // a width or height of 0: no change
//   bool Large = State.ReadBool("LargeButtons", true);
//   State.EraseSection();
//   State.WriteFormBounds();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnForms.h"
#include "platform/Registry.h"

namespace formkit {

/// One section of the dialog state. Does not own the form it measures.
class FK_API TIDEDialogRegistryServices {
public:
  /// The section is "Property Editors\" + `Key` (or + the form's class name when `Key`
  /// is empty) with `AEditorsSection`, else `Key` alone; below `BaseKey` (the host's
  /// base registry key: `BaseRegistryKey` when empty) of `Store`. `Form` gives the
  /// monitor whose density scales values; may be null (no scaling then).
  TIDEDialogRegistryServices(const String& Key, bool AEditorsSection, TCustomForm* Form,
                             const String& BaseKey = String(), TRegistryStore& Store = RegistryStore());
  ~TIDEDialogRegistryServices();
  TIDEDialogRegistryServices(const TIDEDialogRegistryServices&) = delete;
  TIDEDialogRegistryServices& operator=(const TIDEDialogRegistryServices&) = delete;

  const String& Section() const noexcept { return FSection; }

  /// Reads "Left", "Top", "Width" and "Height" into the form's bounds; a width or height
  /// of 0 (or none kept) changes nothing. The form is moved into its monitor's work area
  /// and its size clipped to it. With `AScaled` the values are kept at 96 pixels per inch.
  void ReadFormBounds(bool AScaled = true);
  void WriteFormBounds(bool AScaled = true);
  [[nodiscard]] bool ReadBool(const String& Ident, bool Default);
  void WriteBool(const String& Ident, bool Value);
  /// With `AScaled` the value is kept at 96 pixels per inch and read at the monitor's.
  [[nodiscard]] int ReadInteger(const String& Ident, int Default, bool AScaled = false);
  void WriteInteger(const String& Ident, int Value, bool AScaled = false);
  [[nodiscard]] bool ValueExists(const String& Ident);
  void EraseSection();

private:
  int ToMonitor(int Value) const;
  int FromMonitor(int Value) const;
  TCustomForm* FForm; // not owned
  String FSection;
  TObjectGuard<TRegistryIniFile> FIni;
};

} // namespace formkit
