//===- tools/ToolsAPI.cpp - Helpers of the general tool interfaces -------===//
//
// The functions that ask the global service object for services, the wizard
// hook, the notifier and file base classes, and the string list adapter.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.h"

#include "platform/Lists.h"

namespace formkit {

namespace {
FK_RESOURCESTRING(SIntfNotSupported, "Interface not supported");
} // namespace

//===----------------------------------------------------------------------===//
// Services of the global service object
//===----------------------------------------------------------------------===//

constinit TLibraryWizardProc LibraryWizardProc = nullptr;

IPtr<IOTAProject> GetActiveProject() {
  if (!HalvernIDEServices) return nullptr;
  IPtr<IOTAModuleServices> Modules = QueryAs<IOTAModuleServices>(HalvernIDEServices);
  if (!Modules) throw EIntfCastError(SIntfNotSupported);
  return Modules->GetActiveProject();
}

IPtr<IOTAPersonalityServices> PersonalityServices() {
  return QueryAs<IOTAPersonalityServices>(HalvernIDEServices);
}

void RegisterPackageWizard(const IPtr<IOTAWizard>& Wizard) {
  if (LibraryWizardProc) LibraryWizardProc(Wizard);
}

//===----------------------------------------------------------------------===//
// TNotifierObject
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TNotifierObject, "ToolsAPI") {}

void TNotifierObject::AfterSave() {}
void TNotifierObject::BeforeSave() {}
void TNotifierObject::Destroyed() {}
void TNotifierObject::Modified() {}

//===----------------------------------------------------------------------===//
// TModuleNotifierObject
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TModuleNotifierObject, "ToolsAPI") {}

void TModuleNotifierObject::AfterSave() { TNotifierObject::AfterSave(); }
void TModuleNotifierObject::BeforeSave() { TNotifierObject::BeforeSave(); }
void TModuleNotifierObject::Destroyed() { TNotifierObject::Destroyed(); }
void TModuleNotifierObject::Modified() { TNotifierObject::Modified(); }
bool TModuleNotifierObject::CheckOverwrite() { return true; }
void TModuleNotifierObject::ModuleRenamed(const String&) {}
bool TModuleNotifierObject::AllowSave() { return true; }
int TModuleNotifierObject::GetOverwriteFileNameCount() { return 0; }
String TModuleNotifierObject::GetOverwriteFileName(int) { return String(); }
void TModuleNotifierObject::SetSaveFileName(const String&) {}

//===----------------------------------------------------------------------===//
// TOTAFile
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TOTAFile, "ToolsAPI") {}

TOTAFile::TOTAFile(String Source, TDateTime Age) : FSource(std::move(Source)), FAge(Age) {}

String TOTAFile::GetSource() { return FSource; }
TDateTime TOTAFile::GetAge() { return FAge; }

IPtr<IOTAFile> StringToIOTAFile(const String& Source) {
  return NewAs<IOTAFile, TOTAFile>(Source, TDateTime(-1));
}

//===----------------------------------------------------------------------===//
// TOTAStringsAdapter
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TOTAStringsAdapter, "ToolsAPI") {}

TOTAStringsAdapter::TOTAStringsAdapter(TStrings* Strings, bool Owned)
    : FStrings(Strings), FOwned(Owned) {}

void TOTAStringsAdapter::BeforeDestruction() {
  if (FOwned) FreeAndNil(FStrings);
  inherited::BeforeDestruction();
}

int TOTAStringsAdapter::GetCount() { return FStrings->Count(); }
String TOTAStringsAdapter::GetItem(int Index) { return FStrings->Get(Index); }
void TOTAStringsAdapter::SetItem(int Index, const String& Value) { FStrings->Put(Index, Value); }
TObject* TOTAStringsAdapter::GetData(int Index) { return FStrings->GetObject(Index); }
void TOTAStringsAdapter::SetData(int Index, TObject* Value) { FStrings->PutObject(Index, Value); }
String TOTAStringsAdapter::GetName(int Index) { return FStrings->Names(Index); }
String TOTAStringsAdapter::GetValue(const String& Name) { return FStrings->Values(Name); }

void TOTAStringsAdapter::SetValue(const String& Name, const String& Value) {
  FStrings->SetValues(Name, Value);
}

String TOTAStringsAdapter::GetValueFromIndex(int Index) { return FStrings->ValueFromIndex(Index); }

void TOTAStringsAdapter::SetValueFromIndex(int Index, const String& Value) {
  FStrings->SetValueFromIndex(Index, Value);
}

void TOTAStringsAdapter::Assign(const IPtr<IOTAStrings>& Source) {
  if (IPtr<INTAStrings> Native = QueryAs<INTAStrings>(Source)) {
    TStrings* Other = Native->GetStrings();
    if (Other != FStrings) FStrings->Assign(Other);
    return;
  }
  FStrings->BeginUpdate();
  // Ending the update tells the list's listeners, which may fail: after a failure here
  // that one passes on, after success theirs does.
  auto End = OnFailure([this]() noexcept { RunIgnoringExceptions([this] { FStrings->EndUpdate(); }); });
  FStrings->Clear();
  int Count = Source ? Source->GetCount() : 0;
  for (int I = 0; I < Count; ++I) FStrings->AddObject(Source->GetItem(I), Source->GetData(I));
  End.Dismiss();
  FStrings->EndUpdate();
}

TStrings* TOTAStringsAdapter::GetStrings() { return FStrings; }

} // namespace formkit
