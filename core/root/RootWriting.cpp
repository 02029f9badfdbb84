//===- core/root/RootWriting.cpp - A module back to its stream and file --===//
//
// A module is written as the difference against its ancestor, in the form it
// came in (text stays text). The image is cached until the next change and lent
// to the host without a copy. Saving writes a temporary file first and only then
// replaces the file, keeping a backup when the module changed since it was
// loaded, so a failure at any step leaves the last good file in place. The links
// from this module's components into other modules make its dependencies.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"
#include "core/root/RootFormEditor.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(sCantSaveModuleWithAFixup,
                  "Module \"%s\" references another module and cannot be saved until %s is loaded");
FK_RESOURCESTRING(sCantSaveModuleWithFixups, "Module \"%s\" references other modules and cannot be saved until the "
                                             "following modules are loaded: %s");
FK_RESOURCESTRING(sReadOnlyError, "'%s' is a read-only file");
FK_RESOURCESTRING(sCantRename, "Unable to rename '%s' to '%s'");

namespace {
/// The buffer of the copy into the file: large forms go in few steps.
constexpr std::int64_t FileCopyBufferSize = 1048576;
/// Open mode of the temporary file: create.
constexpr int CreateFileMode = 65280;

String CommaText(const std::vector<String>& Names) {
  TStringList List;
  for (const String& Name : Names) List.Add(Name);
  return List.CommaText();
}
} // namespace

//===----------------------------------------------------------------------===//
// The module's stream
//===----------------------------------------------------------------------===//

TStream* TComponentRoot::GetRootStream() {
  if (FDormantStream) {
    FDormantStream->SetPosition(0);
    return FDormantStream;
  }
  if (!FRootStream) {
    if (FOTAFormEditor) FOTAFormEditor->FormSaving();
    if (FModule) {
      FModule->BeforeSave();
      FModule->Notify(ncFormSaving);
    }
    if (FCustomModule) FCustomModule->Saving();
    // The module and its descendants come up to date with what they inherit.
    if (FRootUpdateManager && TRootHooks::UpdateManagerUpdate) TRootHooks::UpdateManagerUpdate(FRootUpdateManager);
    TObjectGuard<TMemoryStream> Image(new TMemoryStream);
    WriteRootStream(Image.Get());
    FRootStream = Image.Release();
  }
  FRootStream->SetPosition(0);
  return FRootStream;
}

bool TComponentRoot::TakeBackRootStream(TMemoryStream* Image, int ModifyTime) noexcept {
  if (FModifyTime != ModifyTime || FRootStream || FDormantStream || !FRoot) return false;
  FRootStream = Image;
  return true;
}

IPtr<IDatedStream> TComponentRoot::FormFileOpen() {
  if (!FRoot && !FDormantStream) return nullptr;
  return NewAs<IDatedStream, TRootStream>(this);
}

void TComponentRoot::CheckFixups() {
  for (;;) {
    std::vector<String> Names;
    GetFixupReferenceNames(FRoot, Names);
    if (Names.empty()) return;
    if (AskRedirectLinks(FRoot->Name(), Names[0]) != qrYes) {
      if (Names.size() == 1) throw EComponentDesignerException(sCantSaveModuleWithAFixup, FRoot->Name(), Names[0]);
      throw EComponentDesignerException(sCantSaveModuleWithFixups, FRoot->Name(), CommaText(Names));
    }
    RedirectLinks(FRoot, Names[0]);
    FReadError = true;
  }
}

void TComponentRoot::WriteRootStream(TStream* Stream) {
  CheckFixups();
  TComponent* Ancestor = FAncestorRoot ? FAncestorRoot->GetRoot() : nullptr;
  bool AsText = FLYTToText || FOrigLYTFormat >= 2;
  TObjectGuard<TMemoryStream> Binary(AsText ? new TMemoryStream : nullptr);
  TStream* Dest = AsText ? Binary.Get() : Stream;
  std::int64_t Fixup = 0;
  Dest->WriteResourceHeader(FRoot->ClassName(), Fixup);
  {
    TObjectGuard<TWriter> Writer(new TWriter(Dest, 4096));
    Writer->OnFindAncestor = TFindAncestorEvent::Bind<&TComponentRoot::WriterFindAncestor>(this);
    Writer->WriteDescendent(FRoot, Ancestor);
  }
  Dest->FixupResourceHeader(Fixup);
  if (!AsText) return;
  Binary->SetPosition(0);
  ObjectResourceToText(Binary.Get(), Stream);
}

void TComponentRoot::WriterFindAncestor(TWriter* Writer, TComponent* Component, const String&,
                                        TComponent*& Ancestor, TComponent*& RootAncestor) {
  if (Ancestor || Component == Writer->Root() || !TRootHooks::IsProxyClass ||
      !TRootHooks::IsProxyClass(Component->ClassType()))
    return;
  auto Frame = QueryAs<IInternalRoot>(FDesigner->OpenRootClass(Component->ClassName()));
  if (!Frame) return;
  Ancestor = Frame->GetRoot();
  RootAncestor = Ancestor;
  if (FUnitDependencies && Frame->GetModule()) FUnitDependencies->Add(Frame->GetModule()->GetUnitName());
}

void TComponentRoot::WriteComponent(TWriter* Writer, TComponent* Component) {
  Writer->OnFindAncestor = TFindAncestorEvent::Bind<&TComponentRoot::WriterFindAncestor>(this);
  Writer->WriteComponent(Component);
}

//===----------------------------------------------------------------------===//
// Saving
//===----------------------------------------------------------------------===//

void TComponentRoot::Save() {
  TStream* Image = GetRootStream();
  if (FReadStreamSize != 0 && FModifyTime == FDiskAge && Image->Size() != FReadStreamSize) {
    // Untouched, yet the stream changed (a component upgraded itself on load).
    FReadStreamSize = 0;
    if (IPtr<IDesignEnvironment> Env = GetEnvironment()) FModifyTime = Env->GetTimestamp();
  }
  int Age = WriteModuleFile(Image, FModifyTime, FDiskAge);
  FDiskAge = Age;
  FModifyTime = Age;
  FOrigLYTFormat = FLYTToText ? 2 : 1;
  for (int I = 0, N = GetViewCount(); I < N; ++I) GetView(I)->Save();
}

int TComponentRoot::WriteModuleFile(TStream* Image, int Stamp, int DiskAge) {
  String Name = FFileName;
  String Temp;
  FDesigner->GetTempFileName(FFileSystem, Name, Temp);
  String Backup;
  if (Stamp != -1 && Stamp != DiskAge) FDesigner->GetBackupFileName(FFileSystem, Name, Backup);
  if (FDesigner->IsFileReadOnly(FFileSystem, Name)) throw EComponentDesignerException(sReadOnlyError, Name);
  if (!Backup.empty() && FDesigner->IsFileReadOnly(FFileSystem, Backup))
    throw EComponentDesignerException(sReadOnlyError, Backup);
  {
    auto DropTemp = OnFailure([&]() noexcept { RunIgnoringExceptions([&] { FDesigner->DeleteFile(FFileSystem, Temp); }); });
    TObjectGuard<TStream> File(FDesigner->OpenFile(FFileSystem, Temp, CreateFileMode));
    File->CopyFrom(Image, 0, FileCopyBufferSize);
    if (Stamp != -1) FDesigner->FileWritten(FFileSystem, File.Get());
    File.Reset();
  }
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  if (!Backup.empty() && Env && Env->GetCreateBackups()) {
    FDesigner->DeleteFile(FFileSystem, Backup);
    RenameModuleFile(Name, Backup);
  } else {
    FDesigner->DeleteFile(FFileSystem, Name);
  }
  RenameModuleFile(Temp, Name);
  return FDesigner->GetFileAge(FFileSystem, Name);
}

void TComponentRoot::RenameModuleFile(const String& OldName, const String& NewName) {
  if (FDesigner->FileExists(FFileSystem, OldName) && !FDesigner->RenameFile(FFileSystem, OldName, NewName))
    throw EComponentDesignerException(sCantRename, OldName, NewName);
}

bool TComponentRoot::CheckFileDate() {
  int Age = FDesigner->GetFileAge(FFileSystem, FFileName);
  if (Age == -1 || Age == FDiskAge) return false;
  FDiskAge = Age;
  return true;
}

//===----------------------------------------------------------------------===//
// Dependencies
//===----------------------------------------------------------------------===//

TComponentRoot* TComponentRoot::GetComponentRootFor(TComponent* Component) {
  if (!Component) return nullptr;
  auto Found = QueryAs<IInternalRoot>(FDesigner->FindRoot(Component));
  return Found ? dynamic_cast<TComponentRoot*>(Found->Implementor()) : nullptr;
}

TComponentRoot* TComponentRoot::GetComponentRootFor(const String& Name) {
  return GetComponentRootFor(FindRootComponent(Name));
}

void TComponentRoot::CollectLinks(TComponent* Instance) {
  if (Instance->ComponentState().Contains(csDestroying)) return;
  TComponent* Top = nullptr;
  for (PPropInfo Prop : Instance->ClassType()->Properties()) {
    if (Prop->Kind() != tkClass || !Prop->IsReadable()) continue;
    TClass Declared = GetObjectPropClass(Prop);
    if (!Declared || !Declared->InheritsFrom(TComponent::StaticClass())) continue;
    if (!Top) {
      Top = RootOf(Instance);
      while (Top && Top->Owner()) Top = Top->Owner();
    }
    auto* V = dynamic_cast<TComponent*>(GetObjectProp(Instance, Prop));
    if (!V || !V->Owner() || V->Owner() == Instance || V->Owner() == Instance->Owner() || V == Instance->Owner())
      continue;
    if (TComponent* Root = RootOf(V); Root != Top)
      if (TComponentRoot* Linked = GetComponentRootFor(Root)) FDependencies.push_back(Linked);
  }
  if (Instance != FRoot && TRootHooks::IsProxyClass && TRootHooks::IsProxyClass(Instance->ClassType())) {
    String Name = Instance->ClassName();
    if (!Name.empty() && (Name[0] == 'T' || Name[0] == 't')) Name.erase(0, 1);
    if (TComponentRoot* Frame = GetComponentRootFor(Name)) FDependencies.push_back(Frame);
  }
}

void TComponentRoot::UpdateDependencies() {
  if (FDependenciesUpToDate) return;
  if (FRoot && !IsDormant()) {
    CollectLinks(FRoot);
    for (int I = 0; I < FRoot->ComponentCount(); ++I) CollectLinks(FRoot->Components(I));
  }
  if (FAncestorRoot && FAncestorRoot->GetModule() != FModule)
    if (auto* Ancestor = dynamic_cast<TComponentRoot*>(FAncestorRoot->Implementor()))
      if (std::find(FDependencies.begin(), FDependencies.end(), Ancestor) == FDependencies.end())
        FDependencies.push_back(Ancestor);
  for (TComponentRoot* D : FDependencies) D->FDependents.push_back(this);
  FDependenciesUpToDate = true;
}

void TComponentRoot::GetDependencies(const std::function<void(const IPtr<IRoot>&)>& Proc) {
  UpdateDependencies();
  std::vector<TComponentRoot*> List = FDependencies;
  for (TComponentRoot* D : List) Proc(D->AsRoot());
}

void TComponentRoot::GetDependentRoots(const std::function<void(const IPtr<IRoot>&)>& Proc) {
  FDesigner->UpdateRootDependents();
  std::vector<TComponentRoot*> List = FDependents;
  for (TComponentRoot* D : List) Proc(D->AsRoot());
}

void TComponentRoot::ClearDependencies() {
  FDependenciesUpToDate = false;
  for (TComponentRoot* D : FDependencies) {
    auto It = std::find(D->FDependents.begin(), D->FDependents.end(), this);
    if (It != D->FDependents.end()) D->FDependents.erase(It);
  }
  FDependencies.clear();
}

void TComponentRoot::ClearDependents() {
  while (!FDependents.empty()) FDependents.back()->ClearDependencies();
}

void TComponentRoot::ClearLinksOf(TComponent* Instance, TComponent* Gone) {
  for (PPropInfo Prop : Instance->ClassType()->Properties()) {
    if (Prop->Kind() != tkClass || !Prop->IsReadable() || !Prop->IsWritable()) continue;
    auto* V = dynamic_cast<TComponent*>(GetObjectProp(Instance, Prop));
    if (V && (V == Gone || V->Owner() == Gone)) SetOrdProp(Instance, Prop, 0);
  }
}

void TComponentRoot::ClearDependenciesOn(TComponent* Component) {
  if (!FRoot) return;
  ClearLinksOf(FRoot, Component);
  for (int I = FRoot->ComponentCount() - 1; I >= 0; --I) {
    if (I >= FRoot->ComponentCount()) continue;
    TComponent* C = FRoot->Components(I);
    ClearLinksOf(C, Component);
    if (C->ClassType() != Component->ClassType()) continue;
    // An embedded copy of the module that goes.
    if (FindSelection(C)) ClearSelection();
    if (IsFrame(C)) InstanceRemoved(C);
    C->Destroy();
  }
}

void TComponentRoot::RemoveDependenciesOn(TComponent* Component) {
  ClearDependenciesOn(Component);
  ClearDependencies();
}

void TComponentRoot::RemoveDependentLinks() {
  if (FRoot) FDesigner->RemoveDependenciesOn(FRoot);
}

bool TComponentRoot::IsFrame(TPersistent* Instance) const {
  return std::find(FModifiableFrames.begin(), FModifiableFrames.end(), Instance) != FModifiableFrames.end();
}

void TComponentRoot::GetUnits(const TGetStrProc& Proc) {
  if (!FRoot) return;
  std::vector<TClass> Classes;
  auto AddClass = [&](TClass C) {
    for (; C && C != TComponent::StaticClass()->Parent; C = C->Parent) {
      if (std::find(Classes.begin(), Classes.end(), C) != Classes.end()) return;
      Classes.push_back(C);
      if (C == TComponent::StaticClass()) return;
    }
  };
  for (int I = 0; I < FRoot->ComponentCount(); ++I) {
    TComponent* C = FRoot->Components(I);
    AddClass(C->ClassType());
    for (PPropInfo Prop : C->ClassType()->Properties())
      if (Prop->Kind() == tkClass && Prop->IsReadable())
        if (TObject* Value = GetObjectProp(C, Prop)) AddClass(Value->ClassType());
    if (TRootHooks::SelectionEditorUnits) TRootHooks::SelectionEditorUnits(*this, C, Proc);
  }
  for (auto It = Classes.rbegin(); It != Classes.rend(); ++It) Proc((*It)->UnitName);
}

} // namespace formkit
