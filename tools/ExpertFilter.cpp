//===- tools/ExpertFilter.cpp - Template filter ---------------------------===//
//
// The run of a filter: lines from the top provider, tags expanded left to right,
// and the decision to write a line taken once the whole line is expanded.
//
//===----------------------------------------------------------------------===//
#include "tools/ExpertFilterClasses.h"

#include "platform/TypInfoBuilder.h"

namespace formkit {

namespace {

constexpr std::string_view TagOpen = "[!";
constexpr char TagClose = ']';
constexpr std::string_view LineEnd = "\r\n";
/// The provider stack grows by this many entries.
constexpr std::size_t ProviderGrowBy = 5;

/// Blanks and control characters off both ends.
std::string_view TrimView(std::string_view S) noexcept {
  std::size_t B = 0, E = S.size();
  while (B < E && static_cast<unsigned char>(S[B]) <= ' ') ++B;
  while (E > B && static_cast<unsigned char>(S[E - 1]) <= ' ') --E;
  return S.substr(B, E - B);
}

bool IsSeparator(char C) noexcept {
  return C == ' ' || C == '\t' || C == '\r' || C == '\n' || C == ',';
}

/// Cuts the text between the parentheses of a tag into tokens: separators drop out,
/// quoted tokens keep everything up to their closing quote and know escapes.
void Tokenize(std::string_view Text, std::vector<String>& Tokens) {
  Tokens.clear();
  std::size_t I = 0;
  const std::size_t N = Text.size();
  while (I < N) {
    char C = Text[I];
    if (IsSeparator(C)) {
      ++I;
      continue;
    }
    if (C != '"' && C != '\'') {
      std::size_t Start = I;
      while (I < N && !IsSeparator(Text[I])) ++I;
      Tokens.emplace_back(Text.substr(Start, I - Start));
      continue;
    }
    const char Quote = C;
    ++I;
    String Token;
    bool Closed = false;
    while (I < N) {
      char D = Text[I];
      if (D == Quote) {
        ++I;
        Closed = true;
        break;
      }
      if (D == '\\' && I + 1 < N) {
        char E = Text[I + 1];
        I += 2;
        switch (E) {
        case '"': Token += '"'; break;
        case '\\': Token += '\\'; break;
        case 'a': Token += '\n'; break;
        case 'b': Token += '\b'; break;
        case 'n': Token += LineEnd; break;
        case 'r': Token += '\r'; break;
        case 't': Token += '\t'; break;
        default: // no escape: both characters stay, and a quote here does not close
          Token += '\\';
          Token += E;
        }
        continue;
      }
      Token += D;
      ++I;
    }
    // A quoted token still open at the end counts, unless it is empty.
    if (Closed || !Token.empty()) Tokens.push_back(std::move(Token));
  }
}

} // namespace

//===----------------------------------------------------------------------===//
// Creation and the property store
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TExpertFilter, "ExpertFilter") {}

IPtr<IExpertFilter> CoExpertFilter::Create() { return New<TExpertFilter>(); }

TExpertFilter::TExpertFilter()
    : FBoolStack(New<TBooleanStack>()), FPropertyValues(New<TPropertyValues>()) {}

//===----------------------------------------------------------------------===//
// Runs
//===----------------------------------------------------------------------===//

String TExpertFilter::Filter(const String& AFileName, const String& ADirectory) {
  String FullName = ADirectory + AFileName;
  if (!detail::LocaleFileExists(FullName)) throw EExpertFilterError(sTemplateFileNotFound, FullName);
  String Chosen = detail::GetLocaleFile(FullName);
  IPtr<ILineProvider> Provider = TFileLineProvider::Open(Chosen);
  FFilename = ExtractFileName(Chosen);
  return Filter(Provider);
}

String TExpertFilter::Filter(const IPtr<ILineProvider>& AProvider) {
  String Buffer;
  if (!AProvider) {
    FFilename.clear();
    return Buffer;
  }
  auto Finish = Finally([this]() noexcept { FinishRun(); });
  FBoolStack->SetErrorReporter(IPtr<IErrorReporter>(this));
  PushProvider(AProvider);
  String Line;
  String Expanded;
  while (FCurLineProviderCount > 0) {
    ILineProvider* Top = TopProvider();
    if (!Top->HasMore()) break;
    Line = Top->NextLine();
    Expanded.clear();
    if (!Line.empty()) ExpandLine(Line, Expanded);
    // Tags of the line may have switched output or changed the provider: decide now.
    ILineProvider* Now = TopProvider();
    if (FOutputOn && FBoolStack->GetCurrentValue() && Now && Now->IsOutputOn()) {
      Buffer += Expanded;
      if (!Expanded.empty() || Line.empty()) Buffer += LineEnd;
    }
  }
  return Buffer;
}

void TExpertFilter::FinishRun() noexcept {
  while (FCurLineProviderCount > 0) {
    IPtr<ILineProvider> Provider = std::move(FLineProviders[--FCurLineProviderCount]);
    // The rest of the stack must be cleaned up and the first error must pass on, so a
    // failing cleanup of one provider is not allowed to stop this.
    RunIgnoringExceptions([&Provider] { Provider->Cleanup(); });
  }
  FBoolStack->Cleanup();
  FFilename.clear();
}

ILineProvider* TExpertFilter::TopProvider() const noexcept {
  return FCurLineProviderCount > 0 ? FLineProviders[FCurLineProviderCount - 1].Get() : nullptr;
}

void TExpertFilter::PushProvider(const IPtr<ILineProvider>& AProvider) {
  if (static_cast<std::size_t>(FCurLineProviderCount) == FLineProviders.size())
    FLineProviders.resize(FLineProviders.size() + ProviderGrowBy);
  FLineProviders[FCurLineProviderCount++] = AProvider;
}

void TExpertFilter::PopProvider() noexcept {
  if (FCurLineProviderCount > 0) FLineProviders[--FCurLineProviderCount] = nullptr;
}

void TExpertFilter::ReportError(const String& AMessage) { Fail(AMessage); }

void TExpertFilter::Fail(const String& AMessage) {
  ILineProvider* Top = TopProvider();
  throw EExpertFilterError(sExpFilterError, FFilename, Top ? Top->LineNumber() : -1, AMessage);
}

//===----------------------------------------------------------------------===//
// Lines and tags
//===----------------------------------------------------------------------===//

void TExpertFilter::ExpandLine(std::string_view ALine, String& AOut) {
  std::size_t Pos = 0;
  for (;;) {
    std::size_t Open = ALine.find(TagOpen, Pos);
    if (Open == std::string_view::npos) {
      AOut.append(ALine.substr(Pos));
      return;
    }
    AOut.append(ALine.substr(Pos, Open - Pos));
    std::size_t Close = ALine.find(TagClose, Open + TagOpen.size());
    // The message shows the text this step was given: what follows the last closed tag.
    if (Close == std::string_view::npos) Fail(Format(LoadResString(sMissingCloseTag), ALine.substr(Pos)));
    std::size_t BodyStart = Open + TagOpen.size();
    ProcessTag(TrimView(ALine.substr(BodyStart, Close - BodyStart)), AOut);
    Pos = Close + 1;
    if (Pos >= ALine.size()) return;
  }
}

void TExpertFilter::ParseArguments(std::string_view ATag, std::size_t AKeywordLength) {
  if (ATag.size() < 3) Fail(Format(LoadResString(sInvalidTagEncountered), ATag));
  std::string_view Args = TrimView(ATag.substr(AKeywordLength));
  if (Args.empty() || Args.front() != '(') Fail(Format(LoadResString(sExpectingOpenParen), ATag));
  if (Args.size() < 2 || Args.back() != ')') Fail(Format(LoadResString(sExpectingCloseParen), ATag));
  Tokenize(Args.substr(1, Args.size() - 2), FTokens);
}

void TExpertFilter::ProcessTag(std::string_view ATag, String& AOut) {
  struct TKeyword {
    std::string_view Text;
    TTagKind Kind;
  };
  // Tested in this order, each as a case-sensitive prefix of the tag.
  static constexpr TKeyword Keywords[] = {
      {"if=", tgIfEqual},       {"if!=", tgIfNotEqual},
      {"else", tgElse},         {"endif", tgEndIf},
      {"set", tgSet},           {"outputon", tgOutputOn},
      {"outputoff", tgOutputOff}, {"outputproperties", tgOutputProperties},
      {"foreach", tgForEach},   {"endforeach", tgEndForEach},
  };
  TTagKind Kind = tgProperty;
  std::size_t KeywordLength = 0;
  for (const TKeyword& K : Keywords) {
    if (ATag.starts_with(K.Text)) {
      Kind = K.Kind;
      KeywordLength = K.Text.size();
      break;
    }
  }

  switch (Kind) {
  case tgIfEqual:
  case tgIfNotEqual: {
    ParseArguments(ATag, KeywordLength);
    if (FTokens.empty()) Fail(Format(LoadResString(sInvalidTagEncountered), ATag));
    String Expected = FTokens.size() > 1 ? FTokens[1] : String(Kind == tgIfEqual ? "True" : "");
    String Actual = detail::VarToStr(FPropertyValues->GetProperty(FTokens[0]));
    bool Same = CompareText(Expected, Actual) == 0;
    FBoolStack->Push(Kind == tgIfEqual ? Same : !Same);
    break;
  }
  case tgElse:
    FBoolStack->ToggleTop();
    break;
  case tgEndIf:
    FBoolStack->Pop();
    break;
  case tgSet:
    ParseArguments(ATag, KeywordLength);
    if (FTokens.empty()) Fail(Format(LoadResString(sInvalidTagEncountered), ATag));
    FPropertyValues->SetProperty(FTokens[0], FTokens.size() > 1 ? TVariant(FTokens[1]) : TVariant());
    break;
  case tgOutputOn:
    FOutputOn = true;
    break;
  case tgOutputOff:
    FOutputOn = false;
    break;
  case tgOutputProperties:
    DumpProperties(FPropertyValues.Get(), 0, AOut);
    break;
  case tgForEach:
    StartLoop(ATag);
    break;
  case tgEndForEach:
    EndLoop();
    break;
  case tgProperty:
    AOut += detail::VarToStr(FPropertyValues->GetProperty(String(ATag)));
    break;
  }
}

//===----------------------------------------------------------------------===//
// Loops
//===----------------------------------------------------------------------===//

void TExpertFilter::StartLoop(std::string_view ATag) {
  ParseArguments(ATag, std::string_view("foreach").size());
  String ItemName;
  String Key;
  if (FTokens.size() == 1) {
    Key = FTokens[0];
  } else if (FTokens.size() == 3 && SameText(FTokens[1], "in")) {
    ItemName = FTokens[0];
    Key = FTokens[2];
  } else {
    Fail(Format(LoadResString(sMalformedForEachTag), ATag));
  }

  if (FCurLineProviderCount > MaxLoopDepth) Fail(Format(LoadResString(sForEachTooDeep), ATag));

  // Anything that is no collection loops over nothing: the body runs once, silent.
  IPtr<ICollectionProperty> Collection = detail::VarToCollection(FPropertyValues->GetProperty(Key));
  if (!Collection) Collection = CoCollectionProperty::Create();

  IPtr<IInterfaceCleanup> ItemNameCleanup;
  if (!ItemName.empty() && !SameText(ItemName, Key))
    ItemNameCleanup = TItemNameOverrider::Create(FPropertyValues, ItemName,
                                                 TVariant(IPtr<IInterface>(Collection)));
  // A collection of another make that takes no counter has no reachable items.
  IPtr<TScopeLineProvider> Scope = TScopeLineProvider::Create(
      IPtr<ILineProvider>(TopProvider()), QueryAs<IIterationCounterConsumer>(Collection),
      ItemNameCleanup, Key);
  PushProvider(IPtr<ILineProvider>(Scope));
}

void TExpertFilter::EndLoop() {
  IPtr<ILineProvider> Top(TopProvider());
  if (!dynamic_cast<TScopeLineProvider*>(Top.Get())) return;
  if (!Top->Restart()) PopProvider();
}

//===----------------------------------------------------------------------===//
// The dump of all properties
//===----------------------------------------------------------------------===//

void TExpertFilter::DumpProperties(IPropertyValues* AValues, int ALevel, String& AOut) {
  int Count = AValues->GetPropertyCount();
  for (int I = 0; I < Count; ++I) {
    if (I > 0) AOut += LineEnd;
    AOut.append(2 * static_cast<std::size_t>(ALevel), ' ');
    AOut += AValues->GetPropertyKey(I);
    AOut += '=';
    TVariant Value = AValues->GetProperty(I);
    IPtr<ICollectionProperty> Collection = detail::VarToCollection(Value);
    if (!Collection) {
      AOut += detail::VarToStr(Value);
      continue;
    }
    int Items = Collection->GetItemCount();
    for (int J = 0; J < Items; ++J) {
      AOut += LineEnd;
      AOut.append(2 * static_cast<std::size_t>(ALevel + 1), ' ');
      AOut += '<';
      AOut += IntToStr(J);
      AOut += '>';
      AOut += LineEnd;
      if (IPtr<IPropertyValues> Item = Collection->GetItem(J)) DumpProperties(Item.Get(), ALevel + 2, AOut);
    }
  }
}

} // namespace formkit
