//===- platform/Registry.cpp - A tree of keys with named values ----------===//
#include "platform/Registry.h"

#include "platform/ScopeGuard.h"

#include <algorithm>
#include <sys/stat.h>

namespace formkit {

namespace detail {

/// One value of a key.
struct TRegValue {
  String Name;
  TRegDataType Type = rdString;
  String Text;
  int Number = 0;
};

/// One key: its name, its values and its subkeys, each in the order of creation.
struct TRegKey {
  String Name;
  std::vector<TRegValue> Values;
  std::vector<std::unique_ptr<TRegKey>> SubKeys;

  TRegKey* SubKey(std::string_view KeyName) const noexcept {
    for (const auto& K : SubKeys)
      if (SameText(K->Name, KeyName)) return K.get();
    return nullptr;
  }
  TRegValue* Value(std::string_view ValueName) noexcept {
    for (TRegValue& V : Values)
      if (SameText(V.Name, ValueName)) return &V;
    return nullptr;
  }
  TRegValue& ValueForWrite(const String& ValueName) {
    if (TRegValue* V = Value(ValueName)) return *V;
    return Values.emplace_back(TRegValue{ValueName, rdString, {}, 0});
  }
};

} // namespace detail

using detail::TRegKey;
using detail::TRegValue;

namespace {

/// The parts of a path; false for an empty part. An empty path has no parts.
bool SplitPath(std::string_view Path, std::vector<String>& Parts) {
  Parts.clear();
  if (Path.empty()) return true;
  size_t Start = 0;
  while (true) {
    size_t End = Path.find('\\', Start);
    std::string_view Part = Path.substr(Start, End == std::string_view::npos ? std::string_view::npos : End - Start);
    if (Part.empty() || Part.find_first_of("\r\n") != std::string_view::npos) return false;
    Parts.emplace_back(Part);
    if (End == std::string_view::npos) return true;
    Start = End + 1;
  }
}

// Escapes for the file: names and texts keep to one line and never hold a bare "=".
String Escape(std::string_view Text) {
  String Out;
  for (char C : Text) {
    switch (C) {
    case '\\': Out += "\\\\"; break;
    case '=': Out += "\\e"; break;
    case '\n': Out += "\\n"; break;
    case '\r': Out += "\\r"; break;
    default: Out += C;
    }
  }
  return Out;
}

bool Unescape(std::string_view Text, String& Out) {
  Out.clear();
  for (size_t I = 0; I < Text.size(); ++I) {
    if (Text[I] != '\\') {
      Out += Text[I];
      continue;
    }
    if (++I == Text.size()) return false;
    switch (Text[I]) {
    case '\\': Out += '\\'; break;
    case 'e': Out += '='; break;
    case 'n': Out += '\n'; break;
    case 'r': Out += '\r'; break;
    default: return false;
    }
  }
  return true;
}

void WriteKey(const TRegKey& Key, const String& Path, String& Out) {
  if (!Path.empty() && (!Key.Values.empty() || Key.SubKeys.empty())) {
    Out += "[" + Path + "]\n";
    for (const TRegValue& V : Key.Values)
      Out += (V.Type == rdInteger ? "i:" + Escape(V.Name) + "=" + IntToStr(V.Number)
                                  : "s:" + Escape(V.Name) + "=" + Escape(V.Text)) + "\n";
  }
  for (const auto& Sub : Key.SubKeys)
    WriteKey(*Sub, Path.empty() ? Sub->Name : Path + "\\" + Sub->Name, Out);
}

TRegKey* Walk(TRegKey* Root, const std::vector<String>& Parts, bool Create) {
  TRegKey* Key = Root;
  for (const String& Part : Parts) {
    TRegKey* Next = Key->SubKey(Part);
    if (!Next) {
      if (!Create) return nullptr;
      Next = Key->SubKeys.emplace_back(std::make_unique<TRegKey>(TRegKey{Part, {}, {}})).get();
    }
    Key = Next;
  }
  return Key;
}

/// Parses one value line "s:Name=Text" or "i:Name=Number"; false when damaged.
bool ParseValue(std::string_view Line, TRegKey& Key) {
  if (Line.size() < 3 || Line[1] != ':' || (Line[0] != 's' && Line[0] != 'i')) return false;
  size_t Eq = Line.find('=', 2);
  if (Eq == std::string_view::npos) return false;
  String Name, Text;
  if (!Unescape(Line.substr(2, Eq - 2), Name) || Name.empty() || !Unescape(Line.substr(Eq + 1), Text)) return false;
  TRegValue& V = Key.ValueForWrite(Name);
  if (Line[0] == 's') {
    V.Type = rdString;
    V.Text = std::move(Text);
    return true;
  }
  try {
    V.Number = StrToInt(Text);
  } catch (const EConvertError&) {
    return false;
  }
  V.Type = rdInteger;
  return true;
}

} // namespace

//===----------------------------------------------------------------------===//
// TRegistryStore
//===----------------------------------------------------------------------===//

TRegistryStore::TRegistryStore() : FRoot(std::make_unique<TRegKey>()) {}
TRegistryStore::~TRegistryStore() = default;

void TRegistryStore::SetFileName(const String& Value) {
  struct stat Info {};
  if (!Value.empty() && ::stat(Value.c_str(), &Info) == 0) {
    LoadFromText(ReadFileText(Value), Value);
    FModified = false;
  } else {
    FModified = true; // the first flush makes the file
  }
  FFileName = Value;
}

void TRegistryStore::Flush() {
  if (FFileName.empty() || !FModified) return;
  WriteFileText(FFileName, SaveToText());
  FModified = false;
}

void TRegistryStore::LoadFromText(const String& Text, const String& Origin) {
  auto Root = std::make_unique<TRegKey>();
  TRegKey* Key = nullptr;
  std::vector<String> Parts;
  int LineNo = 0;
  size_t Pos = 0;
  while (Pos < Text.size()) {
    size_t End = Text.find('\n', Pos);
    if (End == String::npos) End = Text.size();
    std::string_view Line(Text.data() + Pos, End - Pos);
    Pos = End + 1;
    ++LineNo;
    if (!Line.empty() && Line.back() == '\r') Line.remove_suffix(1);
    if (Line.empty()) continue;
    bool Good;
    if (Line.front() == '[') {
      Good = Line.back() == ']' && SplitPath(Line.substr(1, Line.size() - 2), Parts) && !Parts.empty();
      if (Good) Key = Walk(Root.get(), Parts, true);
    } else {
      Good = Key && ParseValue(Line, *Key);
    }
    if (!Good) throw ERegistryException(SRegBadFile, Origin, LineNo);
  }
  FRoot = std::move(Root);
  FModified = true;
}

String TRegistryStore::SaveToText() const {
  String Out;
  WriteKey(*FRoot, String(), Out);
  return Out;
}

void TRegistryStore::Clear() {
  FRoot = std::make_unique<TRegKey>();
  FModified = true;
}

TRegKey* TRegistryStore::FindKey(const String& Path, bool Create) {
  std::vector<String> Parts;
  if (!SplitPath(Path, Parts)) return nullptr;
  if (Create) {
    // Only the creation of a missing key is a change.
    TRegKey* Existing = Walk(FRoot.get(), Parts, false);
    if (Existing) return Existing;
    FModified = true;
  }
  return Walk(FRoot.get(), Parts, Create);
}

String TRegistryStore::ExactPath(const String& Path) const {
  std::vector<String> Parts;
  if (!SplitPath(Path, Parts)) return Path;
  String Exact;
  const TRegKey* Key = FRoot.get();
  for (const String& Part : Parts) {
    Key = Key->SubKey(Part);
    if (!Key) return Path;
    Exact += (Exact.empty() ? "" : "\\") + Key->Name;
  }
  return Exact;
}

bool TRegistryStore::RemoveKey(const String& Path) {
  std::vector<String> Parts;
  if (!SplitPath(Path, Parts) || Parts.empty()) return false;
  String Last = Parts.back();
  Parts.pop_back();
  TRegKey* Parent = Walk(FRoot.get(), Parts, false);
  if (!Parent) return false;
  auto It = std::find_if(Parent->SubKeys.begin(), Parent->SubKeys.end(),
                         [&](const auto& K) { return SameText(K->Name, Last); });
  if (It == Parent->SubKeys.end()) return false;
  Parent->SubKeys.erase(It);
  FModified = true;
  return true;
}

TRegistryStore& RegistryStore() {
  static TRegistryStore Store;
  return Store;
}

//===----------------------------------------------------------------------===//
// TRegistry
//===----------------------------------------------------------------------===//

String TRegistry::Resolve(const String& Key, bool& Valid) const {
  std::vector<String> Parts;
  String Path;
  if (!Key.empty() && Key.front() == '\\') Path = Key.substr(1);
  else if (Key.empty()) Path = FCurrentPath;
  else Path = FCurrentPath.empty() ? Key : FCurrentPath + "\\" + Key;
  Valid = SplitPath(Path, Parts);
  return Path;
}

bool TRegistry::OpenKey(const String& Key, bool CanCreate) {
  bool Valid;
  String Path = Resolve(Key, Valid);
  if (!Valid) return false;
  if (!FStore->FindKey(Path, false)) {
    if (!CanCreate || !FStore->FindKey(Path, true)) return false;
    FChanged = true;
  }
  FCurrentPath = FStore->ExactPath(Path);
  FOpen = true;
  FReadOnly = false;
  return true;
}

bool TRegistry::OpenKeyReadOnly(const String& Key) {
  if (!OpenKey(Key, false)) return false;
  FReadOnly = true;
  return true;
}

void TRegistry::CloseKey() {
  FCurrentPath.clear();
  FOpen = false;
  FReadOnly = false;
  if (std::exchange(FChanged, false)) FStore->Flush();
}

bool TRegistry::KeyExists(const String& Key) {
  bool Valid;
  String Path = Resolve(Key, Valid);
  return Valid && FStore->FindKey(Path, false);
}

bool TRegistry::CreateKey(const String& Key) {
  bool Valid;
  String Path = Resolve(Key, Valid);
  if (!Valid || !FStore->FindKey(Path, true)) return false;
  FChanged = true;
  return true;
}

bool TRegistry::DeleteKey(const String& Key) {
  bool Valid;
  String Path = Resolve(Key, Valid);
  if (!Valid || !FStore->RemoveKey(Path)) return false;
  FChanged = true;
  return true;
}

TRegKey* TRegistry::OpenedKey(bool Create) { return FOpen ? FStore->FindKey(FCurrentPath, Create) : nullptr; }

void TRegistry::GetKeyNames(TStrings* Strings) {
  Strings->Clear();
  if (TRegKey* Key = OpenedKey(false))
    for (const auto& Sub : Key->SubKeys) Strings->Add(Sub->Name);
}

bool TRegistry::HasSubKeys() {
  TRegKey* Key = OpenedKey(false);
  return Key && !Key->SubKeys.empty();
}

bool TRegistry::ValueExists(const String& Name) {
  TRegKey* Key = OpenedKey(false);
  return Key && Key->Value(Name);
}

TRegDataType TRegistry::GetDataType(const String& Name) {
  TRegKey* Key = OpenedKey(false);
  TRegValue* V = Key ? Key->Value(Name) : nullptr;
  return V ? V->Type : rdUnknown;
}

void TRegistry::GetValueNames(TStrings* Strings) {
  Strings->Clear();
  if (TRegKey* Key = OpenedKey(false))
    for (const TRegValue& V : Key->Values) Strings->Add(V.Name);
}

bool TRegistry::DeleteValue(const String& Name) {
  TRegKey* Key = FReadOnly ? nullptr : OpenedKey(false);
  if (!Key) return false;
  auto It = std::find_if(Key->Values.begin(), Key->Values.end(), [&](const TRegValue& V) { return SameText(V.Name, Name); });
  if (It == Key->Values.end()) return false;
  Key->Values.erase(It);
  FStore->MarkModified();
  FChanged = true;
  return true;
}

String TRegistry::ReadString(const String& Name) {
  TRegKey* Key = OpenedKey(false);
  TRegValue* V = Key ? Key->Value(Name) : nullptr;
  if (!V) return String();
  if (V->Type != rdString) throw ERegistryException(SRegInvalidDataType, Name);
  return V->Text;
}

int TRegistry::ReadInteger(const String& Name) {
  TRegKey* Key = OpenedKey(false);
  TRegValue* V = Key ? Key->Value(Name) : nullptr;
  if (!V) throw ERegistryException(SRegGetDataFailed, Name);
  if (V->Type != rdInteger) throw ERegistryException(SRegInvalidDataType, Name);
  return V->Number;
}

TRegKey* TRegistry::WritableKey(const String& Name) {
  if (!FOpen || FReadOnly) throw ERegistryException(SRegNoKeyOpen, Name);
  // The open key may have been deleted through another cursor: writing makes it again.
  TRegKey* Key = OpenedKey(true);
  FStore->MarkModified();
  FChanged = true;
  return Key;
}

void TRegistry::WriteString(const String& Name, const String& Value) {
  TRegValue& V = WritableKey(Name)->ValueForWrite(Name);
  V.Type = rdString;
  V.Text = Value;
}

void TRegistry::WriteInteger(const String& Name, int Value) {
  TRegValue& V = WritableKey(Name)->ValueForWrite(Name);
  V.Type = rdInteger;
  V.Number = Value;
  V.Text.clear();
}

//===----------------------------------------------------------------------===//
// TRegistryIniFile
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TRegistryIniFile, "Registry") {}

TRegistryIniFile::TRegistryIniFile(const String& Key, TRegistryStore& Store)
    : TCustomIniFile(Key.empty() || Key.front() != '\\' ? Key : Key.substr(1)), FStore(&Store) {}

bool TRegistryIniFile::OpenSection(TRegistry& Reg, const String& Section, bool Create) {
  return Reg.OpenKey("\\" + FileName(), Create) && !Section.empty() && Reg.OpenKey(Section, Create);
}

String TRegistryIniFile::ReadString(const String& Section, const String& Ident, const String& Default) {
  TRegistry Reg(*FStore);
  if (!OpenSection(Reg, Section, false)) return Default;
  switch (Reg.GetDataType(Ident)) {
  case rdString: return Reg.ReadString(Ident);
  case rdInteger: return IntToStr(Reg.ReadInteger(Ident));
  default: return Default;
  }
}

void TRegistryIniFile::WriteString(const String& Section, const String& Ident, const String& Value) {
  TRegistry Reg(*FStore);
  if (!OpenSection(Reg, Section, true)) throw ERegistryException(SRegNoKeyOpen, Ident);
  Reg.WriteString(Ident, Value);
}

void TRegistryIniFile::ReadSection(const String& Section, TStrings* Strings) {
  TRegistry Reg(*FStore);
  Strings->Clear();
  if (OpenSection(Reg, Section, false)) Reg.GetValueNames(Strings);
}

void TRegistryIniFile::ReadSections(TStrings* Strings) {
  TRegistry Reg(*FStore);
  Strings->Clear();
  if (Reg.OpenKey("\\" + FileName(), false)) Reg.GetKeyNames(Strings);
}

void TRegistryIniFile::EraseSection(const String& Section) {
  TRegistry Reg(*FStore);
  if (Reg.OpenKey("\\" + FileName(), false) && !Section.empty()) (void)Reg.DeleteKey(Section);
}

void TRegistryIniFile::DeleteKey(const String& Section, const String& Ident) {
  TRegistry Reg(*FStore);
  if (OpenSection(Reg, Section, false)) (void)Reg.DeleteValue(Ident);
}

bool TRegistryIniFile::ValueExists(const String& Section, const String& Ident) {
  TRegistry Reg(*FStore);
  return OpenSection(Reg, Section, false) && Reg.ValueExists(Ident);
}

} // namespace formkit
