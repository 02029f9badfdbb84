//===- tests/fakes/RecordingServices.h - The host's service object -------===//
//
// A global service object that offers a recording palette, so tests see the
// palette's batches and context names.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ToolServices.h"
#include "tests/fakes/CallLog.h"

namespace formkit::fakes {

class TRecordingPalette : public TInterfacedObject, public IOTAPaletteServices {
  FK_CLASS(TRecordingPalette, TInterfacedObject)
  FK_INTERFACES(IOTAPaletteServices)
  explicit TRecordingPalette(TCallLog* Log) : FLog(Log) {}
  void BeginUpdate() override { FLog->Add("Palette.BeginUpdate"); }
  void EndUpdate() override { FLog->Add("Palette.EndUpdate"); }
  void AddContextName(const String& Name) override { FLog->Add("Palette.Add(" + Name + ")"); }
  void RemoveContextName(const String& Name) override { FLog->Add("Palette.Remove(" + Name + ")"); }

private:
  TCallLog* FLog;
};

class TServicesBase : public TInterfacedObject, public IHalvernIDEServices {
  FK_CLASS(TServicesBase, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices)
};

/// Answers to `IHalvernIDEServices` and, when it has one, to the palette's interface,
/// handing out the palette's own reference.
class TRecordingServices : public TServicesBase {
  FK_CLASS(TRecordingServices, TServicesBase)
  IPtr<TRecordingPalette> Palette;
  void* GetInterfaceEntry(const TGUID& IID) override {
    if (Palette && detail::ChainHas<IOTAPaletteServices>(IID)) return Palette->GetInterfaceEntry(IID);
    return inherited::GetInterfaceEntry(IID);
  }
  bool QueryInterface(const TGUID& IID, void** Obj) override {
    if (Palette && detail::ChainHas<IOTAPaletteServices>(IID)) return Palette->QueryInterface(IID, Obj);
    return GetInterface(IID, Obj);
  }
};

} // namespace formkit::fakes
