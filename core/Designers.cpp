//===- core/Designers.cpp - The one collection of designers --------------===//
#include "core/Designers.h"

#include "core/CustomModules.h"
#include "core/DesignNotifications.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TDesigners, "ComponentDesigner") {}

namespace {
IPtr<IInternalComponentDesigners> TheDesigners;
std::vector<TInitializeDesigner>* InitializeProcs = nullptr;

bool SameRoot(const IPtr<IRoot>& A, const IPtr<IRoot>& B) {
  return QueryAs<IInterface>(A).Get() == QueryAs<IInterface>(B).Get();
}

void RemoveNativeContext() {
  if (auto Palette = IDEService<IOTAPaletteServices>()) Palette->RemoveContextName(NativeDesignerActiveContext);
}
} // namespace

std::function<void(bool)> RegisterStringsFileSystemProc;

//===----------------------------------------------------------------------===//
// Forwards to the designers
//===----------------------------------------------------------------------===//

bool TDesigners::DesignerActive() {
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners))
    if (D->GetActive()) return true;
  return false;
}

void TDesigners::DesignerOptionsChanged() {
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners)) D->DesignerOptionsChanged();
}

bool TDesigners::FindFile(const String& Name, IPtr<IRoot>& Root) {
  Root = nullptr;
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners)) {
    D->FindFile(Name, Root);
    if (Root) return true;
  }
  return false;
}

void TDesigners::HideWindows() {
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners)) D->HideWindows();
}

void TDesigners::ShowWindows() {
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners)) D->ShowWindows();
}

void TDesigners::SetControlsLocked(bool Value) {
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners)) D->SetControlsLocked(Value);
}

bool TDesigners::GetControlsLocked() { return FActiveDesigner ? FActiveDesigner->GetControlsLocked() : false; }

IPtr<IOTAAlignable> TDesigners::GetAlignable() {
  if (!FActiveDesigner) return nullptr;
  return QueryAs<IOTAAlignable>(FActiveDesigner->GetActiveRoot());
}

void TDesigners::GetSelection(const IPtr<IDesignerSelections>& List) {
  if (FActiveDesigner) FActiveDesigner->GetSelection(List);
}

void TDesigners::SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                              const IPtr<IDesignerSelections>& Selections) {
  if (FActiveDesigner) FActiveDesigner->SetSelection(Designer, Window, Selections);
}

IPtr<IInternalRoot> TDesigners::ActiveInternalRoot() {
  return FActiveDesigner ? QueryAs<IInternalRoot>(FActiveDesigner->GetActiveRoot()) : nullptr;
}

void TDesigners::ShowComponentHelp() {
  if (FActiveDesigner)
    if (IPtr<IRoot> Root = FActiveDesigner->GetActiveRoot()) Root->ShowHelp();
}

bool TDesigners::SpecialPropertyHelp(const String& Member, String& HelpKeyword, String& HelpFile, int& HelpType) {
  HelpKeyword.clear();
  HelpFile.clear();
  IPtr<IInternalRoot> Root = ActiveInternalRoot();
  return Root ? Root->SpecialPropertyHelp(Member, HelpKeyword, HelpFile, HelpType) : false;
}

void TDesigners::GetProperties(const TGetPropProc& Proc) {
  if (FActiveDesigner) FActiveDesigner->GetProperties(Proc);
}

String TDesigners::GetFirstSelectionType() { return FActiveDesigner ? FActiveDesigner->GetFirstSelectionType() : ""; }
String TDesigners::GetFirstSelectionUnit() { return FActiveDesigner ? FActiveDesigner->GetFirstSelectionUnit() : ""; }

IPtr<IComponentDesigner> TDesigners::DesignerFromExtension(const String& Ext) {
  for (size_t I = 0; I < FExtensions.size(); ++I)
    if (CompareText(FExtensions[I], Ext) == 0) return FDesigners[I];
  return nullptr;
}

bool TDesigners::RootComponentClass(TClass ComponentClass) {
  return FindCustomModuleReg([&](TCustomModuleReg* R) { return R->FBaseClass == ComponentClass; }) != nullptr;
}

String TDesigners::GetCustomModuleIdentifier(const IPtr<ICustomModule>& CustomModule) {
  IInterface* Wanted = QueryAs<IInterface>(CustomModule).Get();
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners))
    for (int I = 0, N = D->GetRootsCount(); I < N; ++I) {
      IPtr<IInternalRoot> Root = QueryAs<IInternalRoot>(D->GetRoots(I));
      if (!Root || QueryAs<IInterface>(Root->GetCustomModule()).Get() != Wanted) continue;
      String Result = Root->GetRoot() ? Root->GetRoot()->QualifiedClassName() : String();
      IPtr<IDesignerModule> Module = Root->GetModule();
      String Identifier = Module ? Module->GetModuleIdentifier() : String();
      if (!Identifier.empty()) Result += "." + Identifier;
      return Result;
    }
  return "";
}

void TDesigners::DesignerDeactivated() {
  bool WasActive = static_cast<bool>(FActiveDesigner);
  FActiveDesigner = nullptr;
  if (WasActive && EvDesignerDeactivated) EvDesignerDeactivated->Send(this);
  RemoveNativeContext();
}

void TDesigners::ForEachDesigner(const TDesignerIterFunc& Func) {
  for (auto& D : std::vector<IPtr<IComponentDesigner>>(FDesigners))
    if (!Func(D)) break;
}

//===----------------------------------------------------------------------===//
// Registration and activation
//===----------------------------------------------------------------------===//

void TDesigners::RegisterDesigner(const IPtr<IComponentDesigner>& Designer) {
  FDesigners.push_back(Designer);
  FExtensions.push_back(Designer->GetDesignerExtension());
  FDataModuleClasses.push_back(Designer->GetDataModuleClass());
  if (!FActiveDesigner) ActivateDesigner(Designer);
}

void TDesigners::UnregisterDesigner(const IPtr<IComponentDesigner>& Designer) {
  for (size_t I = 0; I < FDesigners.size(); ++I) {
    if (FDesigners[I] != Designer) continue;
    FDesigners.erase(FDesigners.begin() + static_cast<std::ptrdiff_t>(I));
    FExtensions.erase(FExtensions.begin() + static_cast<std::ptrdiff_t>(I));
    FDataModuleClasses.erase(FDataModuleClasses.begin() + static_cast<std::ptrdiff_t>(I));
    break;
  }
  if (FActiveDesigner == Designer) {
    FActiveDesigner = nullptr;
    FActiveRoot = nullptr;
  }
}

void TDesigners::ActivateDesigner(const IPtr<IComponentDesigner>& Designer) {
  bool Changed = Designer != FActiveDesigner;
  IPtr<IRoot> Root = Designer ? Designer->GetActiveRoot() : nullptr;
  if (!Changed && SameRoot(Root, FActiveRoot)) {
    if (FActiveDesigner)
      if (auto Palette = IDEService<IOTAPaletteServices>()) Palette->AddContextName(NativeDesignerActiveContext);
  } else {
    FActiveDesigner = Designer;
    FActiveRoot = Root;
    IPtr<ICustomModule> CustomModule;
    if (Root && EvRootActivatedEvent)
      if (auto Internal = QueryAs<IInternalRoot>(Root)) CustomModule = Internal->GetCustomModule();
    if (EvRootActivatedEvent) EvRootActivatedEvent->Send(this, CustomModule);
  }
  if (Changed && Designer)
    if (IPtr<IDesignEnvironment> Environment = Designer->GetEnvironment()) Environment->SelectionChanged();
}

void TDesigners::RootRemoved(const IPtr<IRoot>& Root) {
  if (SameRoot(Root, FActiveRoot)) FActiveRoot = nullptr;
}

void TDesigners::ActivateNonKilnDesigner() {
  if (EvRootActivatedEvent) EvRootActivatedEvent->SendWithoutPalette(nullptr, StubCustomModule());
}

//===----------------------------------------------------------------------===//
// Free functions
//===----------------------------------------------------------------------===//

IPtr<IInternalComponentDesigners> Designers() { return TheDesigners; }

IPtr<IComponentDesigner> ActiveDesigner() { return TheDesigners ? TheDesigners->GetActiveDesigner() : nullptr; }

IPtr<IRoot> ActiveRoot() {
  IPtr<IComponentDesigner> D = ActiveDesigner();
  return D ? D->GetActiveRoot() : nullptr;
}

void RegisterInitializeDesigner(TInitializeDesigner Proc) {
  if (!InitializeProcs) InitializeProcs = new std::vector<TInitializeDesigner>;
  if (std::find(InitializeProcs->begin(), InitializeProcs->end(), Proc) == InitializeProcs->end())
    InitializeProcs->push_back(Proc);
}

void InitializeDesigners(const IPtr<IDesignEnvironment>& Environment) {
  if (InitializeProcs)
    for (TInitializeDesigner Proc : std::vector<TInitializeDesigner>(*InitializeProcs)) Proc(Environment);
  if (RegisterStringsFileSystemProc) RegisterStringsFileSystemProc(true);
}

IPtr<IDesignEnvironment> ProtectEnvironment(const IPtr<IDesignEnvironment>& Environment) { return Environment; }

void InitializeDesignersUnit() {
  if (!TheDesigners) TheDesigners = NewAs<IInternalComponentDesigners, TDesigners>();
}

void FinalizeDesignersUnit() noexcept {
  TheDesigners = nullptr;
  delete InitializeProcs;
  InitializeProcs = nullptr;
}

} // namespace formkit
