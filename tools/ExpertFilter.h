//===- tools/ExpertFilter.h - Template filter ----------------------------===//
//
// A line-oriented macro processor that turns a text template into source text.
// The caller fills name and value pairs and collections of property sets, gives
// the filter a template file or a line provider, and gets a string back. Tags
// stand between "[!" and "]": conditions (`if=`, `if!=`, `else`, `endif`),
// `set`, output switches, a dump of all properties, and `foreach` loops over
// collections; `[!name]` expands to a property's text. Output lines end with a
// carriage return and a line feed on every platform.
//
// Example:
//   IPtr<IExpertFilter> Filter = CoExpertFilter::Create();
//   Filter->SetProperty("UnitName", "Main");
//   IPtr<ICollectionProperty> Forms = CoCollectionProperty::Create();
//   IPtr<IPropertyValues> Form = CoPropertyValues::Create();
//   Form->SetProperty("Name", "TMainForm");
//   Forms->AddItem(Form);
//   Filter->SetCollectionProperty("Forms", Forms);
//   String Source = Filter->Filter("unit.tpl", "/templates/");
//   // unit.tpl:  unit [!UnitName];
//   //            [!foreach(f in Forms)]
//   //            type [!f.Name] = class end;
//   //            [!endforeach]
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"
#include "platform/Variants.h"

namespace formkit {

/// Every error of a filter run: a malformed tag, an unbalanced stack, a missing
/// template. Messages of a run start with the template's name and line number.
FK_EXCEPTION(EExpertFilterError, Exception);

struct ICollectionProperty;

//===----------------------------------------------------------------------===//
// Public interfaces
//===----------------------------------------------------------------------===//

/// A set of named values: text, numbers, Booleans and collections. Keys compare
/// without regard to ASCII case. A key with a dot reads through the current item
/// of a collection that a loop runs over: "item.Name".
struct FK_API IPropertyValues : IInterface {
  FK_INTERFACE(IPropertyValues, IInterface, "{7FF4D587-67A9-4A0D-8153-80A3FA0FEC09}")
  /// Replaces the value of an existing key, or appends the pair.
  virtual void SetProperty(const String& AKey, const TVariant& AValue) = 0;
  /// Stores the collection as a value of interface type (`varUnknown`).
  virtual void SetCollectionProperty(const String& AKey,
                                     const IPtr<ICollectionProperty>& ACollection) = 0;
  virtual int GetPropertyCount() = 0;
  /// The value at `AIndex`, in order of first assignment; raises `EListError` outside
  /// the range.
  virtual TVariant GetProperty(int AIndex) = 0;
  /// The value of a key, through the current item of a collection for a dotted key;
  /// unassigned when there is none.
  virtual TVariant GetProperty(const String& AKey) = 0;
  /// The key at `AIndex`; raises `EListError` outside the range.
  virtual String GetPropertyKey(int AIndex) = 0;
  virtual void ClearProperties() = 0;
};

/// An ordered collection of property sets that a `foreach` loop runs over. While
/// a loop runs, the collection knows its current item.
struct FK_API ICollectionProperty : IInterface {
  FK_INTERFACE(ICollectionProperty, IInterface, "{4EB343E9-CA18-461C-9BA6-FE5581CE499F}")
  virtual void AddItem(const IPtr<IPropertyValues>& AItem) = 0;
  /// Raises `EListError` outside the range.
  virtual IPtr<IPropertyValues> GetItem(int AIndex) = 0;
  virtual int GetItemCount() = 0;
  /// The item of the running iteration; null when no loop runs over the collection.
  virtual IPtr<IPropertyValues> GetCurrentItem() = 0;
};

/// A source of template lines. A loop is itself a provider stacked on the one it
/// reads from, so that its body can be replayed.
struct FK_API ILineProvider : IInterface {
  FK_INTERFACE(ILineProvider, IInterface, "{2B3EDD36-AA9E-4B9A-8D34-94EDCB928085}")
  virtual bool HasMore() = 0;
  /// The next line without its end of line.
  virtual String NextLine() = 0;
  /// The number of the line last read, from 1; used in messages.
  virtual int LineNumber() = 0;
  /// Starts the next round of a loop; false when the provider is done with.
  virtual bool Restart() = 0;
  /// Lets go of what the provider holds; called once the run no longer needs it.
  virtual void Cleanup() = 0;
  /// Whether lines read from this provider may reach the output.
  virtual bool IsOutputOn() = 0;
};

/// The filter: a property store that turns templates into text. An object serves
/// one run: create it, fill its properties, call `Filter` once, drop it.
struct FK_API IExpertFilter : IPropertyValues {
  FK_INTERFACE(IExpertFilter, IPropertyValues, "{9D2EBDCA-241A-46C2-820A-6425BD2BE786}")
  /// Filters the file `ADirectory` + `AFileName` (joined as they are: give the
  /// directory with its separator). A file may start with a byte order mark.
  virtual String Filter(const String& AFileName, const String& ADirectory) = 0;
  /// Filters the lines of any provider; a null provider gives empty text. Every
  /// provider still open at the end, the given one too, is cleaned up.
  virtual String Filter(const IPtr<ILineProvider>& AProvider) = 0;
};

//===----------------------------------------------------------------------===//
// Internal interfaces
//===----------------------------------------------------------------------===//

/// Takes the errors of the parts of a run and raises them with the run's place.
struct FK_API IErrorReporter : IInterface {
  FK_INTERFACE(IErrorReporter, IInterface, "{5D0F9A62-9BAB-4CAC-A859-DE08B48590BE}")
  virtual void ReportError(const String& AMessage) = 0;
};

/// The nesting of conditions: a branch is on only when every enclosing one is.
struct FK_API IBooleanStack : IInterface {
  FK_INTERFACE(IBooleanStack, IInterface, "{BC1CA420-4075-4416-A0B6-65789301076E}")
  /// Empties the stack and lets go of the error reporter.
  virtual void Cleanup() = 0;
  /// True when no entry is False (so also for an empty stack).
  virtual bool AllTrue() = 0;
  /// True for an empty stack, else true only when all entries are.
  virtual bool GetCurrentValue() = 0;
  virtual int GetSize() = 0;
  /// Reports "Attempt to access empty stack" when empty.
  virtual bool GetTop() = 0;
  /// Removes and returns the top; reports "Attempt to pop an empty stack" when empty.
  virtual bool Pop() = 0;
  virtual void Push(bool AValue) = 0;
  /// Inverts the top; reports "Attempt to access empty stack" when empty.
  virtual void ToggleTop() = 0;
};

/// The running iteration of a loop.
struct FK_API IIterationCounter : IInterface {
  FK_INTERFACE(IIterationCounter, IInterface, "{E766217C-0EDE-4BDB-A0C5-A16B27A463B6}")
  /// From 0; -1 when there is no current item.
  virtual int GetCurrentIteration() = 0;
};

/// A collection that a loop tells which iteration runs.
struct FK_API IIterationCounterConsumer : IInterface {
  FK_INTERFACE(IIterationCounterConsumer, IInterface, "{B05B1121-859E-4CF4-AA66-8A3F7A13EA5F}")
  /// Set while a loop runs over the collection; null at its end.
  virtual void SetCounter(const IPtr<IIterationCounter>& ACounter) = 0;
  /// The number of iterations: the item count.
  virtual int GetMaxIteration() = 0;
};

/// Undoes what an object did to others, at the end of a loop.
struct FK_API IInterfaceCleanup : IInterface {
  FK_INTERFACE(IInterfaceCleanup, IInterface, "{7B7B467E-3CDC-45B3-AC5A-4CEFD58DE057}")
  virtual void Cleanup() = 0;
};

//===----------------------------------------------------------------------===//
// Factories
//===----------------------------------------------------------------------===//

namespace detail {
/// The handle of a loaded module, whose text resources a provider reads.
using TModuleHandle = std::uintptr_t;
/// A text resource that a module does not have.
FK_EXCEPTION(EResNotFound, Exception);
} // namespace detail

/// Makes filters. Each returns the one reference to a new object.
class FK_API CoExpertFilter {
public:
  static IPtr<IExpertFilter> Create();
};

/// Makes empty property sets, the items of collections.
class FK_API CoPropertyValues {
public:
  static IPtr<IPropertyValues> Create();
};

/// Makes empty collections.
class FK_API CoCollectionProperty {
public:
  static IPtr<ICollectionProperty> Create();
};

/// Makes a provider over the text resource `AResourceName` of module `AInstance`;
/// raises `detail::EResNotFound` "Resource %s not found" when the module has none.
class FK_API CoResourceProvider {
public:
  static IPtr<ILineProvider> Create(detail::TModuleHandle AInstance, const String& AResourceName);
};

//===----------------------------------------------------------------------===//
// Stand-ins for services of the run time
//===----------------------------------------------------------------------===//

namespace detail {

/// Registers raw bytes as the text resource `AName` of module `AInstance`, replacing
/// one of the same name (names compare without regard to ASCII case). Stands in for
/// the resources linked into a module.
FK_API void RegisterTextResource(TModuleHandle AInstance, const String& AName, std::string_view AData);
/// Removes a registration; false when there was none.
FK_API bool UnregisterTextResource(TModuleHandle AInstance, const String& AName);
/// The bytes of a registered resource; false when there is none.
FK_API bool FindTextResource(TModuleHandle AInstance, const String& AName, String& AData);

/// The language whose variants of template files are preferred: "dir/name" is
/// first looked for as "dir/<language>/name". Empty (the default) means none.
FK_API void SetLocaleLanguage(const String& ALanguage);
FK_API String GetLocaleLanguage();
/// Whether the file exists in the language's variant or as it is named.
FK_API bool LocaleFileExists(const String& AFileName);
/// The language's variant when it exists, else the name as given.
FK_API String GetLocaleFile(const String& AFileName);

} // namespace detail

} // namespace formkit
