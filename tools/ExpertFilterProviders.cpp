//===- tools/ExpertFilterProviders.cpp - Line providers -------------------===//
//
// Where template lines come from: files, text resources of modules, and the
// recorded body of a running loop. Also the registry of text resources and the
// choice of a language's variant of a template file.
//
//===----------------------------------------------------------------------===//
#include "tools/ExpertFilterClasses.h"

#include "platform/TypInfoBuilder.h"

#include <filesystem>
#include <fstream>
#include <map>
#include <mutex>
#include <sstream>

namespace formkit {

//===----------------------------------------------------------------------===//
// Text resources
//===----------------------------------------------------------------------===//

namespace detail {

namespace {
struct TResourceRegistry {
  std::mutex Lock;
  std::map<std::pair<TModuleHandle, String>, String> Data;
};
TResourceRegistry& Resources() {
  static TResourceRegistry* Registry = new TResourceRegistry; // immortal: read during teardown
  return *Registry;
}

struct TLocaleSetting {
  std::mutex Lock;
  String Language;
};
TLocaleSetting& Locale() {
  static TLocaleSetting* Setting = new TLocaleSetting;
  return *Setting;
}
} // namespace

void RegisterTextResource(TModuleHandle AInstance, const String& AName, std::string_view AData) {
  auto& R = Resources();
  std::lock_guard<std::mutex> Guard(R.Lock);
  R.Data[{AInstance, UpperCase(AName)}] = String(AData);
}

bool UnregisterTextResource(TModuleHandle AInstance, const String& AName) {
  auto& R = Resources();
  std::lock_guard<std::mutex> Guard(R.Lock);
  return R.Data.erase({AInstance, UpperCase(AName)}) > 0;
}

bool FindTextResource(TModuleHandle AInstance, const String& AName, String& AData) {
  auto& R = Resources();
  std::lock_guard<std::mutex> Guard(R.Lock);
  auto It = R.Data.find({AInstance, UpperCase(AName)});
  if (It == R.Data.end()) return false;
  AData = It->second;
  return true;
}

//===----------------------------------------------------------------------===//
// Language variants of files
//===----------------------------------------------------------------------===//

void SetLocaleLanguage(const String& ALanguage) {
  auto& L = Locale();
  std::lock_guard<std::mutex> Guard(L.Lock);
  L.Language = ALanguage;
}

String GetLocaleLanguage() {
  auto& L = Locale();
  std::lock_guard<std::mutex> Guard(L.Lock);
  return L.Language;
}

namespace {
bool IsFile(const String& AFileName) {
  std::error_code Ec;
  return !AFileName.empty() && std::filesystem::is_regular_file(AFileName, Ec);
}

/// "dir/name" as "dir/<language>/name"; empty without a language.
String LanguageVariant(const String& AFileName) {
  String Language = GetLocaleLanguage();
  if (Language.empty()) return String();
  std::size_t Sep = AFileName.find_last_of("/\\");
  if (Sep == String::npos) return Language + "/" + AFileName;
  return AFileName.substr(0, Sep + 1) + Language + AFileName.substr(Sep);
}
} // namespace

bool LocaleFileExists(const String& AFileName) {
  String Variant = LanguageVariant(AFileName);
  return (!Variant.empty() && IsFile(Variant)) || IsFile(AFileName);
}

String GetLocaleFile(const String& AFileName) {
  String Variant = LanguageVariant(AFileName);
  if (!Variant.empty() && IsFile(Variant)) return Variant;
  return AFileName;
}

} // namespace detail

//===----------------------------------------------------------------------===//
// TFileLineProvider
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TFileLineProvider, "ExpertFilter") {}

namespace {
/// UTF-16 bytes after a byte order mark to UTF-8; an odd last byte is dropped.
String DecodeUtf16(std::string_view Bytes, bool BigEndian) {
  WideString Units;
  Units.reserve(Bytes.size() / 2);
  for (std::size_t I = 0; I + 1 < Bytes.size(); I += 2) {
    auto Lo = static_cast<unsigned char>(Bytes[I + (BigEndian ? 1 : 0)]);
    auto Hi = static_cast<unsigned char>(Bytes[I + (BigEndian ? 0 : 1)]);
    Units.push_back(static_cast<char16_t>(Lo | (Hi << 8)));
  }
  return Utf16ToUtf8(Units);
}

bool StartsWithBytes(std::string_view Text, std::string_view Mark) {
  return Text.size() >= Mark.size() && Text.substr(0, Mark.size()) == Mark;
}

constexpr std::string_view Utf8Mark("\xEF\xBB\xBF", 3);
} // namespace

IPtr<TFileLineProvider> TFileLineProvider::Open(const String& AFileName) {
  std::ifstream In(AFileName, std::ios::binary);
  if (!In) throw EExpertFilterError(sTemplateOpenError, AFileName);
  std::ostringstream Raw;
  Raw << In.rdbuf();
  if (In.bad()) throw EExpertFilterError(sTemplateOpenError, AFileName);
  String Bytes = std::move(Raw).str();

  IPtr<TFileLineProvider> Result = New<TFileLineProvider>();
  if (StartsWithBytes(Bytes, Utf8Mark)) {
    Result->FText = Bytes.substr(Utf8Mark.size());
  } else if (StartsWithBytes(Bytes, std::string_view("\xFF\xFE", 2))) {
    Result->FText = DecodeUtf16(std::string_view(Bytes).substr(2), false);
    Result->FIsUTF8 = false;
  } else if (StartsWithBytes(Bytes, std::string_view("\xFE\xFF", 2))) {
    Result->FText = DecodeUtf16(std::string_view(Bytes).substr(2), true);
    Result->FIsUTF8 = false;
  } else {
    // Without a mark, the system's code page, which is UTF-8 here: bytes pass as they are.
    Result->FText = std::move(Bytes);
  }
  return Result;
}

String TFileLineProvider::NextLine() {
  std::size_t End = FText.find_first_of("\r\n", FPos);
  String Line;
  if (End == String::npos) {
    Line = FText.substr(FPos);
    FPos = FText.size();
  } else {
    Line = FText.substr(FPos, End - FPos);
    FPos = End + ((FText[End] == '\r' && End + 1 < FText.size() && FText[End + 1] == '\n') ? 2 : 1);
  }
  ++FLineNumber;
  return Line;
}

//===----------------------------------------------------------------------===//
// TResourceProvider
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TResourceProvider, "ExpertFilter") {}

IPtr<ILineProvider> CoResourceProvider::Create(detail::TModuleHandle AInstance,
                                               const String& AResourceName) {
  return TResourceProvider::Create(AInstance, AResourceName);
}

IPtr<TResourceProvider> TResourceProvider::Create(detail::TModuleHandle AInstance,
                                                  const String& AResourceName) {
  String Data;
  if (!detail::FindTextResource(AInstance, AResourceName, Data))
    throw detail::EResNotFound(detail::sResNotFound, AResourceName);
  IPtr<TResourceProvider> Result = New<TResourceProvider>();
  Result->FLines = SplitResourceText(Data);
  return Result;
}

std::vector<String> TResourceProvider::SplitResourceText(std::string_view AData) {
  std::size_t Zero = AData.find('\0');
  if (Zero != std::string_view::npos) AData = AData.substr(0, Zero);
  if (StartsWithBytes(AData, Utf8Mark)) AData.remove_prefix(Utf8Mark.size());
  // Without a mark the system's code page applies, UTF-8 here: the bytes stay as they are.
  std::vector<String> Lines;
  std::size_t Pos = 0;
  while (Pos <= AData.size()) {
    std::size_t End = AData.find('\r', Pos);
    if (End == std::string_view::npos) End = AData.size();
    std::string_view Piece = AData.substr(Pos, End - Pos);
    while (!Piece.empty() && Piece.front() == '\n') Piece.remove_prefix(1);
    if (!Piece.empty()) Lines.emplace_back(Piece);
    Pos = End + 1;
  }
  return Lines;
}

String TResourceProvider::NextLine() {
  if (FLineNumber >= static_cast<int>(FLines.size())) return String();
  return FLines[FLineNumber++];
}

//===----------------------------------------------------------------------===//
// TScopeLineProvider
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TScopeLineProvider, "ExpertFilter") {}

IPtr<TScopeLineProvider> TScopeLineProvider::Create(
    const IPtr<ILineProvider>& AOuterScope, const IPtr<IIterationCounterConsumer>& AConsumer,
    const IPtr<IInterfaceCleanup>& AItemNameCleanup, const String& ACollectionPropName) {
  IPtr<TScopeLineProvider> Result = New<TScopeLineProvider>();
  Result->FOuterScope = AOuterScope;
  Result->FOuterOutputOff = AOuterScope && !AOuterScope->IsOutputOn();
  Result->FItemNameCleanup = AItemNameCleanup;
  Result->FCollectionPropName = ACollectionPropName;
  Result->FIterationCounterConsumer = AConsumer;
  Result->FHaveNoIterationItem = !AConsumer || AConsumer->GetMaxIteration() == 0;
  if (AConsumer) AConsumer->SetCounter(IPtr<IIterationCounter>(Result));
  return Result;
}

bool TScopeLineProvider::HasMore() {
  if (FCurrentIteration == 0) return FOuterScope && FOuterScope->HasMore();
  int Last = FIterationCounterConsumer ? FIterationCounterConsumer->GetMaxIteration() - 1 : -1;
  // Replaying stops at the end of the record even before the last iteration: a body
  // that was all on the line of its `foreach` left nothing to replay.
  return FCurrentIteration <= Last && FReplayLineIndex < static_cast<int>(FMyLines.size());
}

String TScopeLineProvider::NextLine() {
  if (FCurrentIteration == 0) {
    if (!FOuterScope) return String();
    // The base is the line of the `foreach` itself, so that base + index, taken after
    // the index moved past a replayed line, is that line's own number.
    if (FMyLines.empty()) FLineNumberBase = FOuterScope->LineNumber();
    FMyLines.push_back(FOuterScope->NextLine());
    return FMyLines.back();
  }
  if (FReplayLineIndex >= static_cast<int>(FMyLines.size())) return String();
  return FMyLines[FReplayLineIndex++];
}

int TScopeLineProvider::LineNumber() {
  if (FCurrentIteration == 0 && FOuterScope) return FOuterScope->LineNumber();
  return FLineNumberBase + FReplayLineIndex;
}

bool TScopeLineProvider::Restart() {
  bool Result = false;
  if (!FHaveNoIterationItem) {
    ++FCurrentIteration;
    if (FCurrentIteration == 1) FOuterScope = nullptr;
    FReplayLineIndex = 0;
    Result = HasMore();
  }
  // An empty loop ends here too, and must give its item name back and leave its
  // collection as well.
  if (!Result) Cleanup();
  return Result;
}

void TScopeLineProvider::Cleanup() {
  if (IPtr<IIterationCounterConsumer> Consumer = std::move(FIterationCounterConsumer))
    Consumer->SetCounter(nullptr);
  FOuterScope = nullptr;
  if (IPtr<IInterfaceCleanup> ItemCleanup = std::move(FItemNameCleanup)) ItemCleanup->Cleanup();
}

} // namespace formkit
