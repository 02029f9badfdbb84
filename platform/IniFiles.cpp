//===- platform/IniFiles.cpp - Key files of sections and values ----------===//
#include "platform/IniFiles.h"

#include "platform/FormatSettings.h"
#include "platform/Streams.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <sys/stat.h>

namespace formkit {

FK_RESOURCESTRING(SIniFileOpenError, "Cannot open file \"%s\". %s");
FK_RESOURCESTRING(SIniFileCreateError, "Cannot create file \"%s\". %s");

//===----------------------------------------------------------------------===//
// Files
//===----------------------------------------------------------------------===//

namespace {
String ErrnoText() { return String(std::strerror(errno)); }

bool FileExists(const String& FileName) {
  struct stat St {};
  return ::stat(FileName.c_str(), &St) == 0;
}
} // namespace

String ReadFileText(const String& FileName) {
  std::FILE* F = std::fopen(FileName.c_str(), "rb");
  if (!F) throw EFOpenError(SIniFileOpenError, FileName, ErrnoText());
  auto Close = Finally([F]() noexcept { std::fclose(F); });
  String Text;
  char Buffer[4096];
  for (;;) {
    std::size_t N = std::fread(Buffer, 1, sizeof Buffer, F);
    Text.append(Buffer, N);
    if (N < sizeof Buffer) break;
  }
  // A directory opens on this platform but reads with an error.
  if (std::ferror(F)) throw EFOpenError(SIniFileOpenError, FileName, ErrnoText());
  return Text;
}

void WriteFileText(const String& FileName, const String& Text) {
  String Temp = FileName + ".tmp";
  std::FILE* F = std::fopen(Temp.c_str(), "wb");
  if (!F) throw EFCreateError(SIniFileCreateError, FileName, ErrnoText());
  auto Drop = OnFailure([&Temp]() noexcept { std::remove(Temp.c_str()); });
  bool Written = std::fwrite(Text.data(), 1, Text.size(), F) == Text.size();
  Written = std::fclose(F) == 0 && Written;
  if (!Written || std::rename(Temp.c_str(), FileName.c_str()) != 0)
    throw EFCreateError(SIniFileCreateError, FileName, ErrnoText());
}

//===----------------------------------------------------------------------===//
// TCustomIniFile
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCustomIniFile, "IniFiles") {}

int TCustomIniFile::ReadInteger(const String& Section, const String& Ident, int Default) {
  String Text = ReadString(Section, Ident, String());
  int Value = Default;
  if (!Text.empty() && !TryStrToInt(Text, Value)) Value = Default;
  return Value;
}

void TCustomIniFile::WriteInteger(const String& Section, const String& Ident, int Value) {
  WriteString(Section, Ident, IntToStr(Value));
}

bool TCustomIniFile::ReadBool(const String& Section, const String& Ident, bool Default) {
  return ReadInteger(Section, Ident, Default ? 1 : 0) != 0;
}

void TCustomIniFile::WriteBool(const String& Section, const String& Ident, bool Value) {
  WriteString(Section, Ident, Value ? "1" : "0");
}

bool TCustomIniFile::SectionExists(const String& Section) {
  TObjectGuard<TStringList> Keys(new TStringList);
  ReadSections(Keys.Get());
  return Keys->IndexOf(Section) >= 0;
}

bool TCustomIniFile::ValueExists(const String& Section, const String& Ident) {
  TObjectGuard<TStringList> Keys(new TStringList);
  ReadSection(Section, Keys.Get());
  return Keys->IndexOf(Ident) >= 0;
}

//===----------------------------------------------------------------------===//
// TMemIniFile
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMemIniFile, "IniFiles") {}

TMemIniFile::TMemIniFile(const String& FileName) : TCustomIniFile(FileName) {
  if (!FileName.empty() && FileExists(FileName)) SetText(ReadFileText(FileName));
}

TMemIniFile::TSection* TMemIniFile::FindSection(const String& Name) noexcept {
  for (TSection& S : FSections)
    if (SameText(S.Name, Name)) return &S;
  return nullptr;
}

TMemIniFile::TKey* TMemIniFile::FindKey(const String& Section, const String& Ident) noexcept {
  TSection* S = FindSection(Section);
  if (!S) return nullptr;
  for (TKey& K : S->Keys)
    if (SameText(K.Name, Ident)) return &K;
  return nullptr;
}

String TMemIniFile::ReadString(const String& Section, const String& Ident, const String& Default) {
  TKey* K = FindKey(Section, Ident);
  return K ? K->Value : Default;
}

void TMemIniFile::WriteString(const String& Section, const String& Ident, const String& Value) {
  if (TKey* K = FindKey(Section, Ident)) {
    K->Value = Value;
    return;
  }
  TSection* S = FindSection(Section);
  if (!S) S = &FSections.emplace_back(TSection{Section, {}});
  S->Keys.push_back({Ident, Value});
}

void TMemIniFile::ReadSection(const String& Section, TStrings* Strings) {
  Strings->Clear();
  if (TSection* S = FindSection(Section))
    for (const TKey& K : S->Keys) Strings->Add(K.Name);
}

void TMemIniFile::ReadSections(TStrings* Strings) {
  Strings->Clear();
  for (const TSection& S : FSections) Strings->Add(S.Name);
}

void TMemIniFile::EraseSection(const String& Section) {
  std::erase_if(FSections, [&](const TSection& S) { return SameText(S.Name, Section); });
}

void TMemIniFile::DeleteKey(const String& Section, const String& Ident) {
  if (TSection* S = FindSection(Section))
    std::erase_if(S->Keys, [&](const TKey& K) { return SameText(K.Name, Ident); });
}

bool TMemIniFile::ValueExists(const String& Section, const String& Ident) {
  return FindKey(Section, Ident) != nullptr;
}

String TMemIniFile::Text() const {
  String Out;
  for (const TSection& S : FSections) {
    Out += "[" + S.Name + "]\n";
    for (const TKey& K : S.Keys) Out += K.Name + "=" + K.Value + "\n";
    Out += "\n";
  }
  return Out;
}

void TMemIniFile::SetText(const String& Value) {
  std::vector<TSection> Read;
  // A repeated header continues its first section.
  std::size_t Current = String::npos;
  std::size_t Pos = 0;
  while (Pos < Value.size()) {
    std::size_t End = Value.find('\n', Pos);
    if (End == String::npos) End = Value.size();
    String Line = Value.substr(Pos, End - Pos);
    Pos = End + 1;
    String Trimmed = Trim(Line);
    if (Trimmed.empty() || Trimmed[0] == ';') continue;
    if (Trimmed.front() == '[' && Trimmed.back() == ']') {
      String Name = Trimmed.substr(1, Trimmed.size() - 2);
      auto Same = [&](const TSection& S) { return SameText(S.Name, Name); };
      auto Found = std::find_if(Read.begin(), Read.end(), Same);
      Current = static_cast<std::size_t>(Found - Read.begin());
      if (Found == Read.end()) Read.push_back({Name, {}});
      continue;
    }
    if (Current == String::npos) continue;
    if (!Line.empty() && Line.back() == '\r') Line.pop_back();
    std::size_t Eq = Line.find('=');
    String Key = Trim(Line.substr(0, Eq));
    String Val = Eq == String::npos ? String() : Line.substr(Eq + 1);
    Read[Current].Keys.push_back({Key, Val});
  }
  FSections = std::move(Read);
}

void TMemIniFile::UpdateFile() {
  if (!FileName().empty()) WriteFileText(FileName(), Text());
}

void TMemIniFile::Rename(const String& FileName, bool Reload) {
  if (Reload) {
    // Read before anything changes, so a failure keeps the contents and the name.
    String Content = FileExists(FileName) ? ReadFileText(FileName) : String();
    SetText(Content);
  }
  SetFileName(FileName);
}

} // namespace formkit
