//===- tools/ExpertFilterClasses.h - Classes behind the template filter --===//
//
// The counted classes that stand behind the interfaces of the template filter:
// property store, collection, condition stack, the filter itself, and the line
// providers over a file, a text resource and a running loop. Hosts use the
// factories of ExpertFilter.h; this header is for the filter's own units and
// for tests that drive a part on its own.
//
// Example:
//   IPtr<TBooleanStack> Stack = New<TBooleanStack>();
//   Stack->Push(true);
//   Stack->Push(false);
//   Stack->GetCurrentValue();   // false: one enclosing branch is off
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tools/ExpertFilter.h"

#include <vector>

namespace formkit {

FK_RESOURCESTRING(sTemplateFileNotFound, "File not found: %s");
FK_RESOURCESTRING(sMissingCloseTag, "Missing closing tag in line '%s'");
FK_RESOURCESTRING(sTopEmptyStack, "Attempt to access empty stack");
FK_RESOURCESTRING(sPopEmptyStack, "Attempt to pop an empty stack");
FK_RESOURCESTRING(sMalformedForEachTag, "Invalid foreach tag encountered '%s'");
FK_RESOURCESTRING(sExpFilterError, "%s(%d): %s");
FK_RESOURCESTRING(sInvalidTagEncountered, "Invalid tag encountered '%s'");
FK_RESOURCESTRING(sExpectingOpenParen, "Expecting open paren in tag '%s'");
FK_RESOURCESTRING(sExpectingCloseParen, "Expecting close paren in tag '%s'");
FK_RESOURCESTRING(sTemplateOpenError, "Cannot open file \"%s\"");
FK_RESOURCESTRING(sForEachTooDeep, "Too many nested foreach tags encountered '%s'");
FK_RESOURCESTRING(sFilterListIndexError, "List index out of bounds (%d)");

namespace detail {
FK_RESOURCESTRING(sResNotFound, "Resource %s not found");

/// The text of a value: empty for an unassigned value, null or an interface
/// (a collection), the standard conversion otherwise ("True" for the Boolean).
FK_API String VarToStr(const TVariant& AValue);
/// The collection a value holds, or null.
FK_API IPtr<ICollectionProperty> VarToCollection(const TVariant& AValue);
} // namespace detail

/// A property store: pairs of key and value in order of first assignment. Keys
/// compare without regard to ASCII case; lookups walk the pairs (sets are small).
class FK_API TPropertyValues : public TInterfacedObject, public IPropertyValues {
  FK_CLASS(TPropertyValues, TInterfacedObject)
  FK_INTERFACES(IPropertyValues)

  void SetProperty(const String& AKey, const TVariant& AValue) override;
  void SetCollectionProperty(const String& AKey,
                             const IPtr<ICollectionProperty>& ACollection) override;
  int GetPropertyCount() override { return FPropCount; }
  TVariant GetProperty(int AIndex) override;
  TVariant GetProperty(const String& AKey) override;
  String GetPropertyKey(int AIndex) override;
  void ClearProperties() override;

private:
  struct TPropEntry {
    String Key;
    TVariant Value;
  };
  /// Grows by 5 entries; the first `FPropCount` are used.
  std::vector<TPropEntry> FPropArray;
  int FPropCount = 0;
};

/// A collection of property sets; knows its current item through the counter that
/// a running loop sets.
class FK_API TCollectionProperty : public TInterfacedObject,
                                   public ICollectionProperty,
                                   public IIterationCounterConsumer {
  FK_CLASS(TCollectionProperty, TInterfacedObject)
  FK_INTERFACES(ICollectionProperty, IIterationCounterConsumer)

  void AddItem(const IPtr<IPropertyValues>& AItem) override;
  IPtr<IPropertyValues> GetItem(int AIndex) override;
  int GetItemCount() override { return FCount; }
  IPtr<IPropertyValues> GetCurrentItem() override;
  void SetCounter(const IPtr<IIterationCounter>& ACounter) override { FCounter = ACounter; }
  int GetMaxIteration() override { return FCount; }

private:
  /// Grows by 5 entries; the first `FCount` are used.
  std::vector<IPtr<IPropertyValues>> FCollProperties;
  int FCount = 0;
  /// The loop that runs over the collection. Counted: the loop's cleanup clears it,
  /// which breaks the cycle between the two.
  IPtr<IIterationCounter> FCounter;
};

/// The condition stack of a run. Errors go to the reporter, which the filter sets
/// at the start of each run; without one they are raised as they are.
class FK_API TBooleanStack : public TInterfacedObject, public IBooleanStack {
  FK_CLASS(TBooleanStack, TInterfacedObject)
  FK_INTERFACES(IBooleanStack)

  /// Counted until `Cleanup`: the filter and its stack refer to each other for
  /// the length of a run only.
  void SetErrorReporter(const IPtr<IErrorReporter>& AReporter) { FErrorReporter = AReporter; }

  void Cleanup() override;
  bool AllTrue() override;
  bool GetCurrentValue() override { return AllTrue(); }
  int GetSize() override { return static_cast<int>(FBoolArray.size()); }
  bool GetTop() override;
  bool Pop() override;
  void Push(bool AValue) override { FBoolArray.push_back(AValue); }
  void ToggleTop() override;

private:
  void Report(const TResString& AMessage);
  std::vector<bool> FBoolArray;
  IPtr<IErrorReporter> FErrorReporter;
};

/// The filter. Forwards its property operations to a store of its own, which
/// loops also write their item names into.
class FK_API TExpertFilter : public TInterfacedObject, public IExpertFilter, public IErrorReporter {
  FK_CLASS(TExpertFilter, TInterfacedObject)
  FK_INTERFACES(IExpertFilter, IErrorReporter)

  TExpertFilter();

  void SetProperty(const String& AKey, const TVariant& AValue) override {
    FPropertyValues->SetProperty(AKey, AValue);
  }
  void SetCollectionProperty(const String& AKey,
                             const IPtr<ICollectionProperty>& ACollection) override {
    FPropertyValues->SetCollectionProperty(AKey, ACollection);
  }
  int GetPropertyCount() override { return FPropertyValues->GetPropertyCount(); }
  TVariant GetProperty(int AIndex) override { return FPropertyValues->GetProperty(AIndex); }
  TVariant GetProperty(const String& AKey) override { return FPropertyValues->GetProperty(AKey); }
  String GetPropertyKey(int AIndex) override { return FPropertyValues->GetPropertyKey(AIndex); }
  void ClearProperties() override { FPropertyValues->ClearProperties(); }

  String Filter(const String& AFileName, const String& ADirectory) override;
  String Filter(const IPtr<ILineProvider>& AProvider) override;

  /// Raises `EExpertFilterError` with the template's name and the current line.
  void ReportError(const String& AMessage) override;

  /// Whether the switches `outputon` and `outputoff` leave output on; true at creation.
  bool OutputOn() const noexcept { return FOutputOn; }

  /// The most loops that may run inside one another. A `foreach` after an
  /// `endforeach` on one line opens its loop inside the iteration that the
  /// `endforeach` just began, whose replay reaches that line again: without a
  /// bound such a template nests without end.
  static constexpr int MaxLoopDepth = 64;

private:
  enum TTagKind : std::uint8_t {
    tgProperty, tgIfEqual, tgIfNotEqual, tgElse, tgEndIf, tgSet, tgOutputOn, tgOutputOff,
    tgOutputProperties, tgForEach, tgEndForEach
  };

  [[noreturn]] void Fail(const String& AMessage);
  void ExpandLine(std::string_view ALine, String& AOut);
  void ProcessTag(std::string_view ATag, String& AOut);
  /// Cuts the parenthesised arguments after the keyword into `FTokens`.
  void ParseArguments(std::string_view ATag, std::size_t AKeywordLength);
  void StartLoop(std::string_view ATag);
  void EndLoop();
  void DumpProperties(IPropertyValues* AValues, int ALevel, String& AOut);
  ILineProvider* TopProvider() const noexcept;
  void PushProvider(const IPtr<ILineProvider>& AProvider);
  void PopProvider() noexcept;
  /// The end of a run, also after an error: providers cleaned up and dropped, the
  /// condition stack emptied (which lets go of this filter), the name forgotten.
  void FinishRun() noexcept;

  bool FOutputOn = true;
  IPtr<TBooleanStack> FBoolStack;
  IPtr<IPropertyValues> FPropertyValues;
  /// A stack that grows by 5 entries; the first `FCurLineProviderCount` are used.
  std::vector<IPtr<ILineProvider>> FLineProviders;
  int FCurLineProviderCount = 0;
  /// The template's name without directories, for messages.
  String FFilename;
  /// The arguments of the tag being processed; kept to reuse their storage.
  std::vector<String> FTokens;
};

/// Lines of a text file. The whole file is read when it is opened; a byte order
/// mark selects UTF-8 or UTF-16, and text without one is taken as UTF-8. Lines end
/// at a carriage return, a line feed or both.
class FK_API TFileLineProvider : public TInterfacedObject, public ILineProvider {
  FK_CLASS(TFileLineProvider, TInterfacedObject)
  FK_INTERFACES(ILineProvider)

  /// Raises `EExpertFilterError` "Cannot open file "%s"" when the file cannot be read.
  static IPtr<TFileLineProvider> Open(const String& AFileName);

  bool HasMore() override { return FPos < FText.size(); }
  String NextLine() override;
  int LineNumber() override { return FLineNumber; }
  bool Restart() override { return false; }
  void Cleanup() override {}
  bool IsOutputOn() override { return true; }

  /// Whether the file was UTF-8 (with a mark or without one) rather than UTF-16.
  bool IsUTF8() const noexcept { return FIsUTF8; }

private:
  String FText;
  std::size_t FPos = 0;
  int FLineNumber = 0;
  bool FIsUTF8 = true;
};

/// Lines of a text resource of a module.
class FK_API TResourceProvider : public TInterfacedObject, public ILineProvider {
  FK_CLASS(TResourceProvider, TInterfacedObject)
  FK_INTERFACES(ILineProvider)

  /// Raises `detail::EResNotFound` when the module has no such resource.
  static IPtr<TResourceProvider> Create(detail::TModuleHandle AInstance, const String& AResourceName);
  /// The lines of raw resource data: cut at the first zero byte, a UTF-8 byte order
  /// mark dropped, split at carriage returns with line feeds at the start of a piece
  /// skipped; pieces left empty are dropped.
  static std::vector<String> SplitResourceText(std::string_view AData);

  bool HasMore() override { return FLineNumber < static_cast<int>(FLines.size()); }
  String NextLine() override;
  int LineNumber() override { return FLineNumber; }
  bool Restart() override { return false; }
  void Cleanup() override {}
  bool IsOutputOn() override { return true; }

private:
  int FLineNumber = 0;
  std::vector<String> FLines;
};

/// The provider of a running `foreach`. The first iteration reads the body from the
/// outer provider and records it; later iterations replay the record, so the
/// template is read once however often the body runs.
class FK_API TScopeLineProvider : public TInterfacedObject,
                                  public ILineProvider,
                                  public IIterationCounter {
  FK_CLASS(TScopeLineProvider, TInterfacedObject)
  FK_INTERFACES(ILineProvider, IIterationCounter)

  /// Gives the new scope to `AConsumer` as its counter. A consumer with no items
  /// makes a scope that runs its body once with output off. `AItemNameCleanup` may
  /// be null.
  static IPtr<TScopeLineProvider> Create(const IPtr<ILineProvider>& AOuterScope,
                                         const IPtr<IIterationCounterConsumer>& AConsumer,
                                         const IPtr<IInterfaceCleanup>& AItemNameCleanup,
                                         const String& ACollectionPropName);

  bool HasMore() override;
  String NextLine() override;
  int LineNumber() override;
  bool Restart() override;
  void Cleanup() override;
  bool IsOutputOn() override { return !FHaveNoIterationItem && !FOuterOutputOff; }
  int GetCurrentIteration() override { return FHaveNoIterationItem ? -1 : FCurrentIteration; }

  const String& CollectionPropName() const noexcept { return FCollectionPropName; }

private:
  IPtr<ILineProvider> FOuterScope;
  std::int32_t FCurrentIteration = 0;
  std::vector<String> FMyLines;
  IPtr<IIterationCounterConsumer> FIterationCounterConsumer;
  std::int32_t FReplayLineIndex = 0;
  std::int32_t FLineNumberBase = -1;
  IPtr<IInterfaceCleanup> FItemNameCleanup;
  bool FHaveNoIterationItem = false;
  /// Set when the scope was opened where output was off (an empty loop around it),
  /// so a loop nested in an empty loop writes nothing either.
  bool FOuterOutputOff = false;
  String FCollectionPropName;
};

/// Lets a loop's item name stand for the collection and puts the name's earlier
/// value back at the loop's end.
class FK_API TItemNameOverrider : public TInterfacedObject, public IInterfaceCleanup {
  FK_CLASS(TItemNameOverrider, TInterfacedObject)
  FK_INTERFACES(IInterfaceCleanup)

  /// Remembers the value of `AKeyName` in `APropValues` and stores `ANewValue` there.
  static IPtr<TItemNameOverrider> Create(const IPtr<IPropertyValues>& APropValues,
                                         const String& AKeyName, const TVariant& ANewValue);
  /// Restores the earlier value, once.
  void Cleanup() override;

private:
  String FKeyName;
  TVariant FPrevValue;
  IPtr<IPropertyValues> FPropValues;
};

} // namespace formkit
