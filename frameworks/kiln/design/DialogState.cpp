//===- frameworks/kiln/design/DialogState.cpp - Where dialogs keep their state ===//
#include "frameworks/kiln/design/DialogState.h"

#include "frameworks/kiln/design/KilnEditors.h"

#include <algorithm>

namespace formkit {

namespace {
constexpr int KeptPPI = 96;
} // namespace

TIDEDialogRegistryServices::TIDEDialogRegistryServices(const String& Key, bool AEditorsSection, TCustomForm* Form,
                                                       const String& BaseKey, TRegistryStore& Store)
    : FForm(Form) {
  String Name = Key.empty() && Form ? String(Form->ClassType()->ClassName) : Key;
  FSection = AEditorsSection ? "Property Editors\\" + Name : Name;
  FIni.Reset(new TRegistryIniFile(BaseKey.empty() ? BaseRegistryKey : BaseKey, Store));
}

TIDEDialogRegistryServices::~TIDEDialogRegistryServices() = default;

int TIDEDialogRegistryServices::ToMonitor(int Value) const {
  TMonitor* Monitor = FForm ? FForm->Monitor() : nullptr;
  return Monitor ? MulDiv(Value, Monitor->PixelsPerInch(), KeptPPI) : Value;
}

int TIDEDialogRegistryServices::FromMonitor(int Value) const {
  TMonitor* Monitor = FForm ? FForm->Monitor() : nullptr;
  return Monitor ? MulDiv(Value, KeptPPI, Monitor->PixelsPerInch()) : Value;
}

void TIDEDialogRegistryServices::ReadFormBounds(bool AScaled) {
  if (!FForm) return;
  int Width = ReadInteger("Width", 0, AScaled);
  int Height = ReadInteger("Height", 0, AScaled);
  if (Width == 0 || Height == 0) return;
  int Left = ReadInteger("Left", FForm->Left(), AScaled);
  int Top = ReadInteger("Top", FForm->Top(), AScaled);
  if (TMonitor* Monitor = FForm->Monitor()) {
    TRect Area = Monitor->WorkareaRect();
    Width = std::min(Width, Area.Width());
    Height = std::min(Height, Area.Height());
    Left = std::clamp(Left, Area.Left, Area.Right - Width);
    Top = std::clamp(Top, Area.Top, Area.Bottom - Height);
  }
  FForm->SetBounds(Left, Top, Width, Height);
}

void TIDEDialogRegistryServices::WriteFormBounds(bool AScaled) {
  if (!FForm) return;
  WriteInteger("Left", FForm->Left(), AScaled);
  WriteInteger("Top", FForm->Top(), AScaled);
  WriteInteger("Width", FForm->Width(), AScaled);
  WriteInteger("Height", FForm->Height(), AScaled);
}

bool TIDEDialogRegistryServices::ReadBool(const String& Ident, bool Default) {
  return FIni->ReadBool(FSection, Ident, Default);
}

void TIDEDialogRegistryServices::WriteBool(const String& Ident, bool Value) { FIni->WriteBool(FSection, Ident, Value); }

int TIDEDialogRegistryServices::ReadInteger(const String& Ident, int Default, bool AScaled) {
  if (!FIni->ValueExists(FSection, Ident)) return Default;
  int Value = FIni->ReadInteger(FSection, Ident, Default);
  return AScaled ? ToMonitor(Value) : Value;
}

void TIDEDialogRegistryServices::WriteInteger(const String& Ident, int Value, bool AScaled) {
  FIni->WriteInteger(FSection, Ident, AScaled ? FromMonitor(Value) : Value);
}

bool TIDEDialogRegistryServices::ValueExists(const String& Ident) { return FIni->ValueExists(FSection, Ident); }

void TIDEDialogRegistryServices::EraseSection() { FIni->EraseSection(FSection); }

} // namespace formkit
