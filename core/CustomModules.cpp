//===- core/CustomModules.cpp - Which custom module serves which root ----===//
#include "core/CustomModules.h"

#include "core/EditorGroups.h"

namespace formkit {

FK_IMPLEMENT(TCustomModuleReg, "ComponentDesigner") {}
FK_IMPLEMENT(TStubCustomModule, "ComponentDesigner") {}

namespace {
std::vector<TCustomModuleReg*> Regs;
IPtr<ICustomModule> Stub;

void RegisterCustomModuleHandler(int Group, TClass BaseClass, TClass CustomModuleClass) {
  Regs.push_back(new TCustomModuleReg(Group, BaseClass, CustomModuleClass));
  RegisterClass(BaseClass); // so that a stream naming that class can be read
}

void DropGroup(int Group) {
  for (size_t I = Regs.size(); I-- > 0;)
    if (Regs[I]->FGroup == Group) {
      Regs[I]->Destroy();
      Regs.erase(Regs.begin() + static_cast<std::ptrdiff_t>(I));
    }
}
} // namespace

const std::vector<TCustomModuleReg*>& CustomModuleRegs() { return Regs; }

TCustomModuleReg* FindCustomModuleReg(const std::function<bool(TCustomModuleReg*)>& Accept) {
  for (size_t I = Regs.size(); I-- > 0;)
    if (Accept(Regs[I])) return Regs[I];
  return nullptr;
}

IPtr<ICustomModule> StubCustomModule() {
  if (!Stub) Stub = NewAs<ICustomModule, TStubCustomModule>();
  return Stub;
}

void InitializeCustomModules() {
  RegisterCustomModuleProc = &RegisterCustomModuleHandler;
  NotifyGroupChange(&DropGroup);
}

void FinalizeCustomModules() noexcept {
  UnnotifyGroupChange(&DropGroup);
  RegisterCustomModuleProc = nullptr;
  for (TCustomModuleReg* R : Regs) R->Destroy();
  Regs.clear();
  Stub = nullptr;
}

} // namespace formkit
