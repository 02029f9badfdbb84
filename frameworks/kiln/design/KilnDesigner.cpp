//===- frameworks/kiln/design/KilnDesigner.cpp - The Kiln designer -------===//
#include "frameworks/kiln/design/KilnDesign.h"
#include "frameworks/kiln/design/ColnEdit.h"
#include "frameworks/kiln/design/KilnCategories.h"
#include "frameworks/kiln/design/KilnActionEditors.h"
#include "frameworks/kiln/design/KilnEditors.h"
#include "frameworks/kiln/design/KilnSprigs.h"
#include "frameworks/kiln/design/PicEdit.h"
#include "frameworks/kiln/design/StrEdit.h"

#include "core/Designers.h"
#include "editors/EditorRegistry.h"
#include "frameworks/kiln/Kiln.h"
#include "inheritance/Proxies.h"
#include "inheritance/UpdateManager.h"
#include "platform/ScopeGuard.h"

#include <sys/stat.h>
#include <cstdio>
#include <unistd.h>

namespace formkit {

FK_IMPLEMENT(TKilnDesigner, "KilnDesign") {}
FK_IMPLEMENT(TKilnCustomModule, "KilnDesign") {}
FK_IMPLEMENT(TKilnFrameModule, "KilnDesign") {}
FK_IMPLEMENT(TKilnDataModuleModule, "KilnDesign") {}

bool KilnComponentClassApplies(TClass ComponentClass) {
  return ComponentClass && ComponentClass->InheritsFrom(TComponent::StaticClass()) &&
         !ComponentClass->InheritsFrom(TCustomForm::StaticClass());
}

void ValidateKilnComponent(ICustomModule& Module, TComponent* Component) {
  if (!Module.ValidateComponentClass(Component->ClassType()))
    throw EComponentDesignerException(sKilnNotAKilnClass, Component->ClassName());
}

void TKilnCustomModule::Create(TComponent* ARoot, const IPtr<IDesigner>& ADesigner) {
  inherited::Create(ARoot, ADesigner);
  FRoot = ARoot;
}

void TKilnDataModuleModule::ValidateComponent(TComponent* Component) {
  if (dynamic_cast<TControl*>(Component)) throw EComponentDesignerException(sKilnControlOnDataModule, Component->ClassName());
  ValidateKilnComponent(*this, Component);
}

bool TKilnDataModuleModule::ValidateComponentClass(TClass ComponentClass) {
  return KilnComponentClassApplies(ComponentClass) && !ComponentClass->InheritsFrom(TControl::StaticClass()) &&
         !IsInvalidDataModuleClass(ComponentClass);
}

IPtr<IRoot> TKilnDesigner::CreateRoot(const IPtr<IDesignerModule>& Module, const String& FileName, bool AExisting,
                                      const String& AFormName, const String& AAncestorName,
                                      const String& AFileSystem, const IPtr<IRoot>& AAncestorRoot,
                                      const String& AViewName) {
  IPtr<TKilnRoot> Root = New<TKilnRoot>();
  Root->Create({IPtr<IComponentDesigner>(this), Module, FileName, AExisting, nullptr, AFormName, AAncestorName,
                AFileSystem, AAncestorRoot, AViewName});
  return WithViews(Root, Module, AViewName);
}

IPtr<IRoot> TKilnDesigner::CreateRootFromStream(const IPtr<IDesignerModule>& Module, const String& FileName,
                                                const String& AFileSystem, const IPtr<IDatedStream>& AStream,
                                                const IPtr<IRoot>& AAncestorRoot, const String& AViewName) {
  IPtr<TKilnRoot> Root = New<TKilnRoot>();
  Root->Create({IPtr<IComponentDesigner>(this), Module, FileName, true, AStream, "", "", AFileSystem, AAncestorRoot,
                AViewName});
  return WithViews(Root, Module, AViewName);
}

IPtr<IRoot> TKilnDesigner::WithViews(const IPtr<TKilnRoot>& Root, const IPtr<IDesignerModule>& Module,
                                     const String& ViewName) {
  if (ViewName.empty()) {
    // A view that cannot be read leaves no half-open module behind.
    auto Undo = OnFailure([&]() noexcept { RunIgnoringExceptions([&] { Root->Close(); }); });
    Root->CreateDesignerViews(Module);
  }
  return Root->AsRoot();
}

TClass TKilnDesigner::GetDataModuleClass() { return TDataModule::StaticClass(); }

bool TKilnDesigner::SupportsRootClass(TClass RootClass) {
  return RootClass->InheritsFrom(TControl::StaticClass()) || RootClass->InheritsFrom(TDataModule::StaticClass());
}

TStream* TKilnDesigner::OpenFile(const String&, const String& Name, int Mode) {
  return new TFileStream(Name, static_cast<std::uint16_t>(Mode));
}

int TKilnDesigner::GetFileAge(const String&, const String& Name) {
  struct stat Info {};
  if (::stat(Name.c_str(), &Info) != 0) return -1;
  return static_cast<int>(Info.st_mtime);
}

bool TKilnDesigner::FileExists(const String&, const String& Name) {
  struct stat Info {};
  return ::stat(Name.c_str(), &Info) == 0 && S_ISREG(Info.st_mode);
}

bool TKilnDesigner::RenameFile(const String&, const String& OldName, const String& NewName) {
  return std::rename(OldName.c_str(), NewName.c_str()) == 0;
}

void TKilnDesigner::GetTempFileName(const String&, const String& Name, String& TempName) {
  TempName = ChangeFileExt(Name, ".$$$");
}

void TKilnDesigner::GetBackupFileName(const String&, const String& Name, String& BackupName) {
  String Ext = ExtractFileExt(Name);
  BackupName = ChangeFileExt(Name, Ext.size() > 1 ? ".~" + Ext.substr(1) : String(".~"));
}

bool TKilnDesigner::IsFileReadOnly(const String&, const String& Name) {
  // The file's own permission, not whether this process could write anyway: a file
  // nobody may write is read-only to its owner's tools, even when they run privileged.
  struct stat Info {};
  return ::stat(Name.c_str(), &Info) == 0 && S_ISREG(Info.st_mode) && (Info.st_mode & (S_IWUSR | S_IWGRP | S_IWOTH)) == 0;
}

bool TKilnDesigner::DeleteFile(const String&, const String& Name) { return std::remove(Name.c_str()) == 0; }

void TKilnDesigner::FileWritten(const String&, TStream*) {}

void InitializeKilnDesigner(const IPtr<IDesignEnvironment>& Environment) {
  if (auto All = Designers()) All->RegisterDesigner(NewAs<IComponentDesigner, TKilnDesigner>(Environment));
}

void RegisterKilnDesignPackage() {
  InitializeKiln();
  InitializeDesignEditors(); // the registries the package's editors and guides go to
  InstallClassProxyHooks();   // designed roots get generated classes
  InstallUpdateManagerHooks(); // descendant modules follow their ancestor
  RegisterCustomModule(TForm::StaticClass(), TKilnCustomModule::StaticClass());
  RegisterCustomModule(TFrame::StaticClass(), TKilnFrameModule::StaticClass());
  RegisterCustomModule(TDataModule::StaticClass(), TKilnDataModuleModule::StaticClass());
  RegisterComponentGuidelines(TControl::StaticClass(), TControlGuidelines::StaticClass());
  RegisterComponentGuidelines(TWinControl::StaticClass(), TWinControlGuidelines::StaticClass());
  RegisterComponentGuidelines(TCustomForm::StaticClass(), TCustomFormGuidelines::StaticClass());
  RegisterSelectionEditor(TDataModule::StaticClass(), TDataModuleSelectionEditor::StaticClass());
  RegisterKilnSprigs();
  RegisterKilnCategories();
  RegisterPictureEditors();
  RegisterKilnActionEditors();
  RegisterStringEditors();
  RegisterCollectionEditor();
  RegisterKilnEditors();
  // Creation on a surface scales by the pixels per inch of the parent control.
  GetPPIForKilnDesignerForIItemFunc = [](const IPtr<IItem>& Item) {
    auto* Control = dynamic_cast<TControl*>(ExtractComponent(Item));
    return Control ? Control->CurrentPPI() : 96;
  };
  RegisterInitializeDesigner(&InitializeKilnDesigner);
}

} // namespace formkit
