//===- host/DesignHost.cpp - A design host over files ---------------------===//
#include "host/DesignHost.h"

#include "core/DesignCore.h"
#include "core/Designers.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "platform/DeviceInfo.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <filesystem>

namespace formkit {

FK_RESOURCESTRING(sInvalidComponentName, "'%s' is not a valid component name");
FK_RESOURCESTRING(sInvalidMethodName, "'%s' is not a valid method name");
FK_RESOURCESTRING(sModuleReadOnly, "Module %s is read-only");
FK_RESOURCESTRING(sModuleNotFound, "Module %s not found");
FK_RESOURCESTRING(sOneSession, "Only one design session can run at a time");

namespace {

/// The palette entry of one class.
class THostPaletteItem : public TClassPaletteItem, public IOTABasePaletteItem {
  FK_CLASS(THostPaletteItem, TClassPaletteItem)
  FK_INTERFACES(IOTABasePaletteItem)
  explicit THostPaletteItem(TClass Class = nullptr) : TClassPaletteItem(Class), FClass(Class) {}
  String GetIDString() override { return FClass ? FClass->ClassName : ""; }
  bool GetEnabled() override { return FClass != nullptr; }

private:
  TClass FClass;
};
FK_IMPLEMENT(THostPaletteItem, "DesignHost") {}

String ParamsOf(const IPtr<IEventInfo>& Info) {
  if (!Info) return "Sender: TObject";
  String Params;
  for (int I = 0; I < Info->GetParamCount(); ++I)
    Params += (I ? "; " : "") + Info->GetParamName(I) + ": " + Info->GetParamType(I);
  return Params;
}

String BaseNameOf(const String& Path) { return std::filesystem::path(Path).stem().string(); }
String DirectoryOf(const String& Path) {
  String Dir = std::filesystem::path(Path).parent_path().string();
  return Dir.empty() ? String(".") : Dir;
}

bool SessionRunning = false;

} // namespace

FK_IMPLEMENT(THostEnvironment, "DesignHost") {}
FK_IMPLEMENT(THostModule, "DesignHost") {}

//===----------------------------------------------------------------------===//
// THostEnvironment
//===----------------------------------------------------------------------===//

TDesignerOptions THostEnvironment::DefaultOptions() {
  TDesignerOptions O;
  O.GridSizeX = 8;
  O.GridSizeY = 8;
  O.SnapToGrid = true;
  O.DisplayGrid = true;
  O.UseDesignerGuidelines = true;
  O.ShowComponentCaptions = true;
  O.ShowNonVisualComponents = true;
  return O;
}

String THostEnvironment::GetPrivateDirectory() {
  const char* Home = std::getenv("HOME");
  return String(Home ? Home : ".") + "/.formkit";
}

String THostEnvironment::GetAppDataDirectory(bool Local) {
  return Local ? GetPrivateDirectory() + "/local" : GetPrivateDirectory();
}

String THostEnvironment::GetIDEVersion() { return "formkit 1.0"; }

void THostEnvironment::GetToolSelected(IPtr<IOTABasePaletteItem>& Item) {
  Item = ToolClass ? InterfaceOf<IOTABasePaletteItem>(New<THostPaletteItem>(ToolClass).Get()) : nullptr;
}

void THostEnvironment::GetPaletteItem(TClass ComponentClass, IPtr<IOTABasePaletteItem>& Item) {
  Item = ComponentClass ? InterfaceOf<IOTABasePaletteItem>(New<THostPaletteItem>(ComponentClass).Get()) : nullptr;
}

void THostEnvironment::OpenModuleByName(const String& Name, const IPtr<IInterface>&) {
  if (!FSession || FSession->Find(Name)) return;
  for (const String& Dir : FSession->SearchPath) {
    String Path = (std::filesystem::path(Dir) / (Name + ".kfm")).string();
    if (std::filesystem::exists(Path)) {
      FSession->Open(Path);
      return;
    }
  }
}

//===----------------------------------------------------------------------===//
// THostModule
//===----------------------------------------------------------------------===//

THostModule::THostModule(const String& FileName) : FFileName(FileName) { FSource.Load(SourceFileName()); }

String THostModule::SourceFileName() const {
  return std::filesystem::path(FFileName).replace_extension(".fks").string();
}

String THostModule::GetUnitName() { return BaseNameOf(FFileName); }

void THostModule::CreateMethod(const String& Name, const IPtr<IEventInfo>& EventInfo) {
  if (!Name.empty() && !IsValidIdent(Name)) throw EComponentDesignerException(sInvalidMethodName, Name);
  FSource.AddMethod(Name, ParamsOf(EventInfo));
}

void THostModule::RenameMethod(const String& CurName, const String& NewName) {
  if (!IsValidIdent(NewName)) throw EComponentDesignerException(sInvalidMethodName, NewName);
  FSource.RenameMethod(CurName, NewName);
}

String THostModule::GetAncestorClassName(const String&) { return FSource.AncestorClass; }

void THostModule::GetMethods(const IPtr<IEventInfo>& EventInfo, const TGetStrProc& Proc) {
  String Wanted = ParamsOf(EventInfo);
  std::vector<String> Names;
  for (const TSourceMethod& M : FSource.Methods())
    if (!EventInfo || M.Params == Wanted) Names.push_back(M.Name);
  for (const String& Name : Names) Proc(Name);
}

bool THostModule::MethodExists(const String& Name, const IPtr<IEventInfo>& EventInfo) {
  const TSourceMethod* M = FSource.FindMethod(Name);
  return M && (!EventInfo || M->Params == ParamsOf(EventInfo));
}

void THostModule::RenameComponent(const IPtr<ICompInfo>& Info, const String& CurName, const String& NewName) {
  auto Declared = [this](const String& Name) {
    return !Name.empty() && std::any_of(FSource.Fields().begin(), FSource.Fields().end(),
                                        [&](const auto& F) { return SameText(F.first, Name); });
  };
  // A name the source or an ancestor's declares already is no new field (a component read
  // again, a nested frame taking its name).
  if (!Declared(CurName) && (Declared(NewName) || (InheritedField && InheritedField(NewName)))) return;
  FSource.RenameField(CurName, NewName, Info ? Info->GetClassName() : String("TComponent"));
}

void THostModule::ValidateComponentName(const IPtr<ICompInfo>&, const String& NewName) {
  if (!IsValidIdent(NewName)) throw EComponentDesignerException(sInvalidComponentName, NewName);
  FSource.ClassName = "T" + NewName;
}

void THostModule::InsertMethodSource(const String& Text, TStrings* Renames, TStrings* Inserted) {
  for (const String& Name : FSource.InsertMethods(Text, [Renames](const String& Name) {
         String Target = Renames ? Renames->Values(Name) : String();
         return Target.empty() ? Name : Target;
       }))
    Inserted->Add(Name);
}

void THostModule::GetViewNames(TStrings* Strings) {
  Strings->Clear();
  for (const String& Line : FSource.Views) Strings->Add(Line);
}

void THostModule::SetViewNames(TStrings* Strings) {
  FSource.Views.clear();
  for (int I = 0; I < Strings->Count(); ++I) FSource.Views.push_back(Strings->Get(I));
  FModified = true;
}

void THostModule::CheckWritable() {
  if (ReadOnly) throw EComponentDesignerException(sModuleReadOnly, GetUnitName());
}

//===----------------------------------------------------------------------===//
// TDesignSession
//===----------------------------------------------------------------------===//

TDesignSession::TDesignSession() {
  if (SessionRunning) throw EHostError(sOneSession);
  StartDesignCore();
  RegisterKilnDesignPackage();
  auto Stop = OnFailure([]() noexcept {
    RunIgnoringExceptions([] { StopDesignCore(); });
    FinalizeKiln();
  });
  FEnvironment = New<THostEnvironment>(this);
  InitializeDesigners(InterfaceOf<IDesignEnvironment>(FEnvironment.Get()));
  FDesigner = Designers()->DesignerFromExtension(".kfm");
  // No one is at the keyboard: every question while a module is read or saved is
  // answered by cancelling, so a broken module is refused rather than changed.
  TKilnRoot::ReadErrorAnswer = [](const String&) { return rerCancel; };
  TKilnRoot::AncestorRecoveryAnswer = [](const String&, const String&, String&, const String&, bool) {
    return rrCancel;
  };
  TKilnRoot::RedirectLinksAnswer = [](const String&, const String&) { return qrCancel; };
  TKilnRoot::DeleteWarningAnswer = [](const String&) { return dwCancel; };
  // The devices a module's views are named after.
  TDeviceInfo::AddDevice("Phone", {{"Size", "360x640"}});
  TDeviceInfo::AddDevice("Tablet", {{"Size", "768x1024"}});
  TDeviceInfo::AddDevice("Desktop", {{"Size", "1280x800"}});
  SessionRunning = true;
}

TDesignSession::~TDesignSession() {
  for (auto It = FModules.rbegin(); It != FModules.rend(); ++It)
    if ((*It)->GetRoot() || QueryAs<IInternalRoot>(*It)->IsDormant()) RunIgnoringExceptions([&] { (*It)->Close(); });
  FModules.clear();
  FRecords.clear();
  if (FDesigner) Designers()->UnregisterDesigner(FDesigner);
  FDesigner = nullptr;
  GetPPIForKilnDesignerForIItemFunc = nullptr;
  StopDesignCore();
  FinalizeKiln();
  FEnvironment = nullptr;
  TDeviceInfo::ClearDevices();
  TKilnRoot::ReadErrorAnswer = nullptr;
  TKilnRoot::AncestorRecoveryAnswer = nullptr;
  TKilnRoot::RedirectLinksAnswer = nullptr;
  TKilnRoot::DeleteWarningAnswer = nullptr;
  SessionRunning = false;
}

bool TDesignSession::AncestorDeclares(const THostModule& Module, const String& Field) const {
  String Ancestor = Module.SourceAncestor();
  if (Ancestor.size() < 2) return false;
  IPtr<IRoot> Root = Find(Ancestor.substr(1));
  THostModule* Record = Root ? ModuleOf(Root) : nullptr;
  if (!Record || Record == &Module) return false;
  for (const auto& [Name, Class] : Record->Source().Fields())
    if (SameText(Name, Field)) return true;
  return AncestorDeclares(*Record, Field);
}

void TDesignSession::Follow(THostModule* Module) {
  Module->InheritedField = [this, Module](const String& Field) { return AncestorDeclares(*Module, Field); };
}

IPtr<IRoot> TDesignSession::Track(IPtr<IRoot> Root, IPtr<THostModule> Module) {
  FModules.push_back(Root);
  FRecords.push_back(std::move(Module));
  return Root;
}

IPtr<IRoot> TDesignSession::Open(const String& Path) {
  if (!std::filesystem::exists(Path)) throw EHostError(sModuleNotFound, Path);
  IPtr<THostModule> Module = New<THostModule>(Path);
  Follow(Module.Get());
  SearchPath.push_back(DirectoryOf(Path));
  auto Pop = Finally([this]() noexcept { SearchPath.pop_back(); });
  IPtr<IRoot> Root = FDesigner->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), Path, true, "", "", "", nullptr, "");
  if (Module->Source().ClassName.empty()) Module->Source().ClassName = "T" + Root->GetRootName();
  return Track(Root, Module);
}

IPtr<IRoot> TDesignSession::NewModule(const String& Path, const String& AncestorName) {
  String Name = BaseNameOf(Path);
  if (!IsValidIdent(Name)) throw EComponentDesignerException(sInvalidComponentName, Name);
  IPtr<THostModule> Module = New<THostModule>(Path);
  Module->Source() = TModuleSource();
  Module->Source().ClassName = "T" + Name;
  Module->Source().AncestorClass = AncestorName.empty() ? String("TForm") : "T" + AncestorName;
  Follow(Module.Get());
  SearchPath.push_back(DirectoryOf(Path));
  auto Pop = Finally([this]() noexcept { SearchPath.pop_back(); });
  IPtr<IRoot> Root = FDesigner->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), Path, false, Name,
                                           AncestorName, "", nullptr, "");
  return Track(Root, Module);
}

void TDesignSession::Save(const IPtr<IRoot>& Root) {
  IPtr<IRoot> Master = Root->GetMasterView() ? Root->GetMasterView() : Root;
  Master->Save();
  if (THostModule* Module = ModuleOf(Master)) {
    Module->SaveSource();
    Module->MarkSaved();
  }
}

void TDesignSession::SaveAs(const IPtr<IRoot>& Root, const String& Path) {
  Root->Rename(Path);
  if (THostModule* Module = ModuleOf(Root)) Module->SetFileName(Root->GetFileName());
  Save(Root);
}

void TDesignSession::Close(const IPtr<IRoot>& Root) {
  auto It = std::find_if(FModules.begin(), FModules.end(), [&](const IPtr<IRoot>& R) { return R.Get() == Root.Get(); });
  if (It == FModules.end()) return;
  std::size_t Index = static_cast<std::size_t>(It - FModules.begin());
  IPtr<IRoot> Keep = Root;
  FModules.erase(It);
  FRecords.erase(FRecords.begin() + static_cast<std::ptrdiff_t>(Index));
  if (Keep->GetRoot()) Keep->Close();
}

IPtr<IRoot> TDesignSession::Find(const String& Name) const {
  for (const IPtr<IRoot>& R : FModules) {
    if (R->GetRoot() && SameText(R->GetRootName(), Name)) return R;
    for (int I = 0, N = R->GetViewCount(); I < N; ++I)
      if (IPtr<IRoot> View = R->GetView(I); View->GetRoot() && SameText(View->GetRootName(), Name)) return View;
  }
  return nullptr;
}

TComponentRoot* TDesignSession::RootOf(const IPtr<IRoot>& Root) {
  auto Internal = QueryAs<IInternalRoot>(Root);
  return Internal ? dynamic_cast<TComponentRoot*>(Internal->Implementor()) : nullptr;
}

THostModule* TDesignSession::ModuleOf(const IPtr<IRoot>& Root) const {
  for (std::size_t I = 0; I < FModules.size(); ++I)
    if (FModules[I].Get() == Root.Get()) return FRecords[I].Get();
  return nullptr;
}

} // namespace formkit
