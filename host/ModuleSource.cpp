//===- host/ModuleSource.cpp - The source file beside a module ------------===//
#include "host/ModuleSource.h"

#include "platform/Classes.h"

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <sstream>

namespace formkit {

FK_RESOURCESTRING(sSourceMalformed, "Source file %s is malformed at line %d");
FK_RESOURCESTRING(sSourceNotWritten, "Cannot write source file %s");

namespace {

String Trimmed(const String& S) {
  std::size_t B = S.find_first_not_of(" \t\r");
  if (B == String::npos) return "";
  std::size_t E = S.find_last_not_of(" \t\r");
  return S.substr(B, E - B + 1);
}

bool StartsWith(const String& S, std::string_view Prefix) { return S.compare(0, Prefix.size(), Prefix) == 0; }

/// "Name(Params)" of a handler line, after "handler ".
bool SplitHeader(const String& Rest, String& Name, String& Params) {
  std::size_t Open = Rest.find('('), Close = Rest.rfind(')');
  if (Open == String::npos || Close == String::npos || Close < Open) return false;
  Name = Trimmed(Rest.substr(0, Open));
  Params = Rest.substr(Open + 1, Close - Open - 1);
  return IsValidIdent(Name);
}

/// Reads the methods of `Lines` from `First` on; `Line` counts for messages.
std::vector<TSourceMethod> ParseMethods(const std::vector<String>& Lines, std::size_t First, const String& Origin) {
  std::vector<TSourceMethod> Methods;
  for (std::size_t I = First; I < Lines.size(); ++I) {
    String Line = Trimmed(Lines[I]);
    if (Line.empty()) continue;
    TSourceMethod M;
    if (!StartsWith(Line, "handler ") || !SplitHeader(Line.substr(8), M.Name, M.Params))
      throw ESourceFileError(sSourceMalformed, Origin, static_cast<int>(I + 1));
    M.Body.clear();
    // The body runs to the first line that is "end" at the left margin.
    for (++I; I < Lines.size(); ++I) {
      M.Body.push_back(Lines[I]);
      if (Lines[I] == "end") break;
    }
    if (M.Body.empty() || M.Body.back() != "end") throw ESourceFileError(sSourceMalformed, Origin, static_cast<int>(I));
    Methods.push_back(std::move(M));
  }
  return Methods;
}

std::vector<String> LinesOf(const String& Text) {
  std::vector<String> Lines;
  std::istringstream In(Text);
  for (String Line; std::getline(In, Line);) Lines.push_back(Line);
  return Lines;
}

} // namespace

void TModuleSource::Load(const String& Path) {
  std::ifstream In(Path, std::ios::binary);
  if (!In) {
    *this = TModuleSource();
    return;
  }
  std::ostringstream Text;
  Text << In.rdbuf();
  SetText(Text.str(), Path);
}

void TModuleSource::SetText(const String& Text, const String& Origin) {
  std::vector<String> Lines = LinesOf(Text);
  TModuleSource Read;
  std::size_t I = 0;
  for (; I < Lines.size() && Trimmed(Lines[I]).empty(); ++I) {
  }
  if (I < Lines.size() && StartsWith(Trimmed(Lines[I]), "class ")) {
    String Rest = Trimmed(Lines[I]).substr(6);
    std::size_t Colon = Rest.find(':');
    Read.ClassName = Trimmed(Rest.substr(0, Colon));
    if (Colon != String::npos) Read.AncestorClass = Trimmed(Rest.substr(Colon + 1));
    if (!IsValidIdent(Read.ClassName)) throw ESourceFileError(sSourceMalformed, Origin, static_cast<int>(I + 1));
    for (++I; I < Lines.size() && StartsWith(Trimmed(Lines[I]), "field "); ++I) {
      String Field = Trimmed(Lines[I]).substr(6);
      std::size_t Colon2 = Field.find(':');
      if (Colon2 == String::npos) throw ESourceFileError(sSourceMalformed, Origin, static_cast<int>(I + 1));
      Read.FFields.emplace_back(Trimmed(Field.substr(0, Colon2)), Trimmed(Field.substr(Colon2 + 1)));
    }
    for (; I < Lines.size() && StartsWith(Trimmed(Lines[I]), "view "); ++I) {
      String View = Trimmed(Lines[I]).substr(5);
      std::size_t Equals = View.find('=');
      String Name = Trimmed(View.substr(0, Equals));
      if (Equals == String::npos || !IsValidIdent(Name))
        throw ESourceFileError(sSourceMalformed, Origin, static_cast<int>(I + 1));
      String Value = Trimmed(View.substr(Equals + 1));
      Read.Views.push_back(Name + "=" + (Value.empty() ? String(" ") : Value));
    }
  }
  Read.FMethods = ParseMethods(Lines, I, Origin);
  *this = std::move(Read);
}

String TModuleSource::Text() const {
  String Out;
  if (!ClassName.empty()) {
    Out += "class " + ClassName + (AncestorClass.empty() ? String() : " : " + AncestorClass) + "\n";
    for (const auto& [Name, Class] : FFields) Out += "  field " + Name + ": " + Class + "\n";
    for (const String& View : Views) Out += "  view " + Trimmed(View) + "\n";
  }
  for (const TSourceMethod& M : FMethods) Out += MethodText(M.Name);
  return Out;
}

void TModuleSource::Save(const String& Path) const {
  String Temp = Path + ".tmp";
  {
    std::ofstream Out(Temp, std::ios::binary | std::ios::trunc);
    String Content = Text();
    Out.write(Content.data(), static_cast<std::streamsize>(Content.size()));
    Out.flush();
    if (!Out) {
      std::remove(Temp.c_str());
      throw ESourceFileError(sSourceNotWritten, Path);
    }
  }
  if (std::rename(Temp.c_str(), Path.c_str()) != 0) {
    std::remove(Temp.c_str());
    throw ESourceFileError(sSourceNotWritten, Path);
  }
}

void TModuleSource::RenameField(const String& CurName, const String& NewName, const String& FieldClass) {
  auto It = std::find_if(FFields.begin(), FFields.end(), [&](const auto& F) { return SameText(F.first, CurName); });
  if (CurName.empty() || It == FFields.end()) {
    if (!NewName.empty()) FFields.emplace_back(NewName, FieldClass);
    return;
  }
  if (NewName.empty()) FFields.erase(It);
  else It->first = NewName;
}

const TSourceMethod* TModuleSource::FindMethod(const String& Name) const {
  auto It = std::find_if(FMethods.begin(), FMethods.end(), [&](const TSourceMethod& M) { return SameText(M.Name, Name); });
  return It == FMethods.end() ? nullptr : &*It;
}

void TModuleSource::AddMethod(const String& Name, const String& Params) {
  if (FindMethod(Name)) return;
  FMethods.push_back({Name, Params, {"begin", "end"}});
}

bool TModuleSource::RenameMethod(const String& CurName, const String& NewName) {
  auto* M = const_cast<TSourceMethod*>(FindMethod(CurName));
  if (!M) return false;
  M->Name = NewName;
  return true;
}

String TModuleSource::MethodText(const String& Name) const {
  const TSourceMethod* M = FindMethod(Name);
  if (!M) return "";
  String Out = "handler " + M->Name + "(" + M->Params + ")\n";
  for (const String& Line : M->Body) Out += Line + "\n";
  return Out;
}

std::vector<String> TModuleSource::InsertMethods(const String& Text,
                                                 const std::function<String(const String&)>& Rename) {
  std::vector<String> Taken;
  for (TSourceMethod& M : ParseMethods(LinesOf(Text), 0, "the pasted text")) {
    M.Name = Rename(M.Name);
    if (FindMethod(M.Name)) continue;
    Taken.push_back(M.Name);
    FMethods.push_back(std::move(M));
  }
  return Taken;
}

} // namespace formkit
