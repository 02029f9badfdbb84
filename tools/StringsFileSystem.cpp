//===- tools/StringsFileSystem.cpp - String list properties as virtual files ===//
#include "tools/StringsFileSystem.h"

#include "core/ComponentDesignerIntf.h"
#include "core/Designers.h"
#include "frameworks/kiln/KilnWindows.h"
#include "platform/ScopeGuard.h"

#include <cmath>

namespace formkit {

namespace {

/// The one instance and the index the host gave it.
IPtr<TStringsFileSystem> TheFileSystem;
int FileSystemIndex = -1;

IPtr<IOTAModuleServices> ModuleServices() { return IDEService<IOTAModuleServices>(); }

/// Days since 1970-01-01 as a civil date (proleptic Gregorian).
void CivilFromDays(long long Z, int& Year, int& Month, int& Day) noexcept {
  Z += 719468;
  const long long Era = (Z >= 0 ? Z : Z - 146096) / 146097;
  const long long Doe = Z - Era * 146097;
  const long long Yoe = (Doe - Doe / 1460 + Doe / 36524 - Doe / 146096) / 365;
  const long long Doy = Doe - (365 * Yoe + Yoe / 4 - Yoe / 100);
  const long long Mp = (5 * Doy + 2) / 153;
  Day = static_cast<int>(Doy - (153 * Mp + 2) / 5 + 1);
  Month = static_cast<int>(Mp < 10 ? Mp + 3 : Mp - 9);
  Year = static_cast<int>(Yoe + Era * 400 + (Month <= 2 ? 1 : 0));
}

/// The designer whose name is `Name`, among the core's designers.
IPtr<IComponentDesigner> DesignerNamed(const String& Name) {
  IPtr<IComponentDesigner> Found;
  if (IPtr<IInternalComponentDesigners> All = Designers())
    All->ForEachDesigner([&](const IPtr<IComponentDesigner>& D) {
      if (SameText(D->GetDesignerName(), Name)) Found = D;
      return !Found;
    });
  return Found;
}

/// The component a virtual file name stands for, or null; the host may be asked to open
/// the module.
TComponent* ResolveComponent(const TStringsFileName& Parts) {
  IPtr<IComponentDesigner> Designer = DesignerNamed(Parts.Designer);
  if (!Designer || Parts.Root.empty()) return nullptr;
  IPtr<IRoot> Root = Designer->FindRoot(Parts.Root);
  if (!Root) {
    if (IPtr<IDesignEnvironment> Env = Designer->GetEnvironment()) Env->OpenModuleByName(Parts.Root, nullptr);
    Root = Designer->FindRoot(Parts.Root);
  }
  if (!Root || !Root->GetRoot() || Parts.Component.empty()) return nullptr;
  return Root->GetRoot()->FindComponent(Parts.Component);
}

} // namespace

//===----------------------------------------------------------------------===//
// File names and dates
//===----------------------------------------------------------------------===//

String MakeStringsFileName(const String& Designer, const String& Root, const String& Component,
                           const String& Property) {
  return Format("%s.%s.%s.%s", Designer, Root, Component, Property);
}

TStringsFileName SplitStringsFileName(const String& FileName) {
  String Rest = ExtractFileName(FileName);
  TStringsFileName Parts;
  String* Heads[] = {&Parts.Designer, &Parts.Root, &Parts.Component};
  for (String* Head : Heads) {
    size_t Dot = Rest.find('.');
    if (Dot == String::npos) {
      *Head = Rest;
      return Parts;
    }
    *Head = Rest.substr(0, Dot);
    Rest.erase(0, Dot + 1);
  }
  Parts.Property = Rest;
  return Parts;
}

String StringsDesignerName(const IPtr<IDesigner>& Designer) {
  IPtr<IInternalComponentDesigners> All = Designers();
  if (!Designer || !All) return String();
  IPtr<IComponentDesigner> Framework = All->DesignerFromExtension(Designer->GetDesignerExtension());
  return Framework ? Framework->GetDesignerName() : String();
}

int DateTimeToFileDate(TDateTime Value) noexcept {
  const double Days = std::floor(Value);
  int Year = 0, Month = 0, Day = 0;
  CivilFromDays(static_cast<long long>(Days) - 25569, Year, Month, Day);
  if (Year < 1980 || Year > 2107) return 0;
  const int Seconds = static_cast<int>((Value - Days) * 86400.0 + 0.5) % 86400;
  const int Date = (Year - 1980) << 9 | Month << 5 | Day;
  const int Time = (Seconds / 3600) << 11 | (Seconds / 60 % 60) << 5 | (Seconds % 60) / 2;
  return static_cast<int>(static_cast<unsigned>(Date) << 16 | static_cast<unsigned>(Time));
}

//===----------------------------------------------------------------------===//
// Notifiers
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TOTANotifier, "StringsFileSystem") {}
FK_IMPLEMENT(TOTAModuleNotifier, "StringsFileSystem") {}
FK_IMPLEMENT(TOTAFormNotifier, "StringsFileSystem") {}

void TOTANotifier::Destroyed() {
  // The entry holds this notifier: keep it alive until the call returns.
  IPtr<IOTANotifier> Self(static_cast<TNotifierObject*>(this));
  if (TActiveTStringsProperty* Owner = std::exchange(FOwner, nullptr)) Owner->Destroy();
}

void TOTAModuleNotifier::ModuleRenamed(const String& NewName) {
  TStringsFileSystem* FileSystem = StringsFileSystem();
  if (!FOwner || !FileSystem) return;
  int Index = FileSystem->IndexOf(FOwner);
  if (Index >= 0 && AnsiCompareFileName(ExtractFileName(NewName), FileSystem->FileName(Index)) == 0) return;
  IPtr<IOTANotifier> Self(static_cast<TNotifierObject*>(this));
  if (IPtr<IOTAModule> Module = FOwner->Module()) Module->SetFileSystem(String());
  std::exchange(FOwner, nullptr)->Destroy();
}

void TOTAFormNotifier::FormSaving() {
  if (FOwner && FOwner->Module()) FOwner->Module()->Save(false, false);
}

void TOTAFormNotifier::ComponentRenamed(TOTAHandle, const String& OldName, const String& NewName) {
  if (FOwner) FOwner->RenameComponent(OldName, NewName);
}

//===----------------------------------------------------------------------===//
// TActiveTStringsProperty
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TActiveTStringsProperty, "StringsFileSystem") {}

void TActiveTStringsProperty::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FModuleNotifier = NewAs<IOTAModuleNotifier, TOTAModuleNotifier>(this);
  FFormModuleNotifier = NewAs<IOTAFormNotifier, TOTAFormNotifier>(this);
}

void TActiveTStringsProperty::BeforeDestruction() {
  if (TStringsFileSystem* FileSystem = StringsFileSystem())
    if (int Index = FileSystem->IndexOf(this); Index >= 0)
      FileSystem->FActiveTStringsProperties->Delete(Index);
  SetModule(nullptr);
  SetComponent(nullptr);
  for (IOTANotifier* Notifier : {static_cast<IOTANotifier*>(FModuleNotifier.Get()),
                                 static_cast<IOTANotifier*>(FFormModuleNotifier.Get())})
    if (auto* Own = dynamic_cast<TOTANotifier*>(Notifier)) Own->Detach();
  inherited::BeforeDestruction();
}

void TActiveTStringsProperty::DetachFormNotifier() noexcept {
  if (FFormEditor && FFormNotifierIndex >= 0) FFormEditor->RemoveNotifier(FFormNotifierIndex);
  FFormEditor = nullptr;
  FFormNotifierIndex = -1;
}

void TActiveTStringsProperty::SetComponent(TComponent* AComponent) {
  if (AComponent == FComponent) return;
  if (FComponent) {
    RemoveFreeNotification(FComponent);
    DetachFormNotifier();
  }
  FComponent = AComponent;
  if (!FComponent) return;
  FreeNotification(FComponent);
  IPtr<IOTAModuleServices> Modules = ModuleServices();
  TComponent* Root = FComponent->Owner();
  IPtr<IOTAModule> RootModule = Modules && Root ? Modules->FindModule(Root->Name()) : nullptr;
  if (!RootModule || RootModule->GetModuleFileCount() == 0) return;
  FFormEditor = QueryAs<IOTAFormEditor>(RootModule->GetModuleFileEditor(RootModule->GetModuleFileCount() - 1));
  if (FFormEditor) FFormNotifierIndex = FFormEditor->AddNotifier(QueryAs<IOTANotifier>(FFormModuleNotifier));
}

void TActiveTStringsProperty::SetModule(const IPtr<IOTAModule>& AModule) {
  if (FModule && FModuleNotifierIndex >= 0) FModule->RemoveNotifier(FModuleNotifierIndex);
  FModuleNotifierIndex = -1;
  FModule = AModule;
  if (FModule) FModuleNotifierIndex = FModule->AddNotifier(FModuleNotifier);
}

void TActiveTStringsProperty::RenameComponent(const String& AOldName, const String& ANewName) {
  TStringsFileSystem* FileSystem = StringsFileSystem();
  int Index = FileSystem ? FileSystem->IndexOf(this) : -1;
  if (Index < 0 || !FComponent) return;
  IPtr<INTAFormEditor> Form = QueryAs<INTAFormEditor>(FFormEditor);
  String Designer = Form ? StringsDesignerName(Form->GetFormDesigner()) : String();
  // The file name holds the names the file was opened under, whether the host tells of
  // the rename before or after it takes effect.
  TStringsFileName Parts = SplitStringsFileName(FileSystem->FileName(Index));
  if (Designer.empty()) Designer = Parts.Designer;
  String NewFileName;
  if (SameText(AOldName, Parts.Component))
    NewFileName = MakeStringsFileName(Designer, Parts.Root, ANewName, FPropertyName);
  else if (SameText(AOldName, Parts.Root))
    NewFileName = MakeStringsFileName(Designer, ANewName, Parts.Component, FPropertyName);
  if (NewFileName.empty()) return;
  FileSystem->FActiveTStringsProperties->Put(Index, NewFileName);
  if (FModule) FModule->SetFileName(NewFileName);
}

void TActiveTStringsProperty::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove || AComponent != FComponent) return;
  FComponent = nullptr;
  DetachFormNotifier();
  // Closing ends in the module's `Destroyed`, which frees this entry; without a module
  // nothing else would.
  if (IPtr<IOTAModule> Module = FModule) Module->CloseModule(true);
  else Destroy();
}

//===----------------------------------------------------------------------===//
// TStringsStream
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStringsStream, "StringsFileSystem") {}

TStrings* TStringsStream::StringsOf(TComponent* AComponent, const String& APropertyName) {
  PPropInfo Prop = GetPropInfo(AComponent, APropertyName);
  if (!Prop || Prop->PropType()->Kind != tkClass)
    throw ENonAIRException(SCantFindProperty, APropertyName, AComponent->Name());
  auto* List = dynamic_cast<TStrings*>(GetObjectProp(AComponent, Prop));
  if (!List) throw ENonAIRException(SStringsPropertyInvalid, APropertyName, AComponent->Name());
  return List;
}

TStringsStream::TStringsStream(TActiveTStringsProperty* AActive, TComponent* AComponent, TStrings* AList, int AMode)
    : TIMemoryStream(new TMemoryStream, soOwned), FComponent(AComponent), FStringsProperty(AList),
      FActiveTStringsProperty(AActive), FModifyTime(AActive->DiskAge()) {
  if (AMode != fmCreate) {
    String Text = AList->Text();
    FStream->WriteBuffer(Text.data(), static_cast<std::int64_t>(Text.size()));
  }
  FStream->SetPosition(0);
}

std::int64_t TStringsStream::Write(const void* Buffer, std::int64_t Count) {
  std::int64_t Written = TIMemoryStream::Write(Buffer, Count);
  if (Count > 0 && Written == Count) {
    FModified = true;
    FModifyTime = DateTimeToFileDate(Now());
  }
  return Written;
}

void TStringsStream::BeforeDestruction() {
  if (FModified && TargetAlive()) StoreText();
  inherited::BeforeDestruction();
}

bool TStringsStream::TargetAlive() const {
  TStringsFileSystem* FileSystem = StringsFileSystem();
  return FileSystem && FileSystem->IndexOf(FActiveTStringsProperty) >= 0 &&
         FActiveTStringsProperty->Component() == FComponent;
}

void TStringsStream::StoreText() noexcept {
  try {
    TMemoryStream* Memory = MemoryStream();
    FStringsProperty->SetText(
        std::string_view(reinterpret_cast<const char*>(Memory->Memory()), static_cast<size_t>(Memory->Size())));
    FActiveTStringsProperty->SetDiskAge(FModifyTime);
    if (IPtr<IDesignerNotify> Designer = FindRootDesigner(FComponent)) Designer->Modified();
  } catch (...) {
    // The host is releasing its stream and cannot hear of a failure; the list keeps
    // what it had.
  }
}

//===----------------------------------------------------------------------===//
// TStringsFileSystem
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStringsFileSystem, "StringsFileSystem") {}

TStringsFileSystem::TStringsFileSystem() : FActiveTStringsProperties(new TStringList) {}

void TStringsFileSystem::BeforeDestruction() {
  FActiveTStringsProperties.Reset();
  inherited::BeforeDestruction();
}

IPtr<IStream> TStringsFileSystem::GetFileStream(const String& FileName, int Mode) {
  String Name = ExtractFileName(FileName);
  TStringsFileName Parts = SplitStringsFileName(Name);
  TComponent* Component = ResolveComponent(Parts);
  if (!Component) throw ENonAIRException(SUnableToFindComponent, Name);
  TStrings* List = TStringsStream::StringsOf(Component, Parts.Property);
  TActiveTStringsProperty* Active = GetTStringsProperty(Name, Component, Parts.Property);
  return NewAs<IStream, TStringsStream>(Active, Component, List, Mode);
}

int TStringsFileSystem::FileAge(const String& FileName) {
  int Index = FActiveTStringsProperties->IndexOf(ExtractFileName(FileName));
  if (Index < 0) return -1;
  return static_cast<TActiveTStringsProperty*>(FActiveTStringsProperties->GetObject(Index))->DiskAge();
}

bool TStringsFileSystem::FileExists(const String& FileName) {
  return ResolveComponent(SplitStringsFileName(FileName)) != nullptr;
}

TActiveTStringsProperty* TStringsFileSystem::GetTStringsProperty(const String& AFileName, TComponent* AComponent,
                                                                 const String& APropertyName) {
  String Name = ExtractFileName(AFileName);
  if (int Index = FActiveTStringsProperties->IndexOf(Name); Index >= 0)
    return static_cast<TActiveTStringsProperty*>(FActiveTStringsProperties->GetObject(Index));
  auto* Active = CreateComponentOf<TActiveTStringsProperty>(Application());
  auto Undo = OnFailure([Active]() noexcept { Active->Destroy(); });
  Active->FPropertyName = APropertyName;
  Active->SetComponent(AComponent);
  IPtr<IOTAModuleServices> Modules = ModuleServices();
  Active->SetModule(Modules ? Modules->FindModule(Name) : nullptr);
  FActiveTStringsProperties->AddObject(Name, Active);
  return Active;
}

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

TStringsFileSystem* StringsFileSystem() noexcept { return TheFileSystem.Get(); }

void RegisterStringsFileSystem() {
  IPtr<IOTAModuleServices> Modules = ModuleServices();
  if (TheFileSystem || !Modules) return;
  TheFileSystem = New<TStringsFileSystem>();
  FileSystemIndex = Modules->AddFileSystem(QueryAs<IOTAFileSystem>(TheFileSystem));
  if (FileSystemIndex < 0) TheFileSystem = nullptr;
}

void UnregisterStringsFileSystem() {
  IPtr<IOTAModuleServices> Modules = ModuleServices();
  if (FileSystemIndex < 0 || !Modules) return;
  TheFileSystem = nullptr;
  Modules->RemoveFileSystem(std::exchange(FileSystemIndex, -1));
}

} // namespace formkit
