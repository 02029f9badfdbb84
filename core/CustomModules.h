//===- core/CustomModules.h - Which custom module serves which root class -===//
//
// Design packages register, for a class of root components, the class of a
// custom module that tailors the designer for such roots. Registrations are
// kept by package group; searches go from the newest to the oldest, so a later
// registration hides an earlier one until its group unloads.
//
// Example:
//   RegisterCustomModule(TMyForm::StaticClass(), TMyFormModule::StaticClass());
//   TClass Module = FindCustomModuleReg("TMyForm", Designer)->FCustomModuleClass;
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

/// One registration.
class FK_API TCustomModuleReg : public TObject {
  FK_CLASS(TCustomModuleReg, TObject)
  TCustomModuleReg() = default;
  TCustomModuleReg(int Group, TClass BaseClass, TClass CustomModuleClass)
      : FGroup(Group), FCustomModuleClass(CustomModuleClass), FBaseClass(BaseClass) {}
  /// The class name of the root class it serves.
  String RegClassName() const { return FBaseClass->ClassName; }

  int FGroup = -1;
  TClass FCustomModuleClass = nullptr;
  TClass FBaseClass = nullptr;
};

/// The registrations in order of registration; empty before the core starts.
FK_API const std::vector<TCustomModuleReg*>& CustomModuleRegs();
/// The newest registration for which `Accept` is true; null when none.
FK_API TCustomModuleReg* FindCustomModuleReg(const std::function<bool(TCustomModuleReg*)>& Accept);

/// The custom module that does nothing, for surfaces outside this library.
class FK_API TStubCustomModule : public TInterfacedObject, public ICustomModule {
  FK_CLASS(TStubCustomModule, TInterfacedObject)
  FK_INTERFACES(ICustomModule)
  TCustomModuleAttributes GetAttributes() override { return {}; }
  void ExecuteVerb(int) override {}
  String GetVerb(int) override { return ""; }
  int GetVerbCount() override { return 0; }
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  void Saving() override {}
  void ValidateComponent(TComponent*) override {}
  bool ValidateComponentClass(TClass) override { return false; }
  bool Nestable() override { return false; }
};

/// The one stub, made at first use; released when the core stops.
FK_API IPtr<ICustomModule> StubCustomModule();

/// The custom-module unit's start and stop (the core's start and stop call them).
FK_API void InitializeCustomModules();
FK_API void FinalizeCustomModules() noexcept;

} // namespace formkit
