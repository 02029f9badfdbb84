//===- inheritance/UpdateFiler.h - Defined properties that follow an ancestor ---===//
//
// A component's defined properties (declared in `DefineProperties` with reader
// and writer callbacks) can only be reached by streaming them. `TUpdateFiler`
// presents itself to an object's `DefineProperties` to learn their names, keeps
// those whose value still equals the ancestor's, and later copies the ancestor's
// current values of exactly those into the descendant through a memory stream.
// One filer belongs to one `TUpdateObject`, which pairs the two objects.
//
// Example:
//   TUpdateFiler Filer(&UpdateObject, /*Compare=*/true);   // first filter pass
//   ...                                                     // the descendant is edited
//   Filer.Filter();                                         // overridden names drop out
//   Filer.Update();                                         // the rest take the ancestor's values
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Filer.h"
#include "platform/Lists.h"

namespace formkit {

class TUpdateObject;

/// What a `DefineProperty` call means to a `TUpdateFiler` at this moment.
enum TUpdateFilterState : std::uint8_t { usFilter, usReading, usWriting, usProbing };

/// Tracks and carries over the defined properties of one descendant object that still
/// follow its ancestor. Owned by its `TUpdateObject`; does not own the objects compared.
class FK_API TUpdateFiler : public TFiler {
  FK_CLASS(TUpdateFiler, TFiler)

  /// Collects the names of the object's defined properties and runs the first filter
  /// pass. With `Compare` false all of them count as following (an object that an
  /// update has just created cannot differ); every later pass compares.
  TUpdateFiler(TUpdateObject* UpdateObject, bool Compare);

  /// Drops the names whose value now differs from the ancestor's. Adds nothing, so the
  /// list only shrinks. Cost: one `DefineProperties` call of the object.
  void Filter();
  /// Copies the ancestor's values of the names still in the list into the object:
  /// written from the ancestor into a memory stream, then read into the object. Does
  /// nothing, and allocates nothing, when the list is empty or when none of the names
  /// would be written (a first pass asks each value whether it differs).
  void Update();
  /// True when no defined property follows the ancestor any more.
  [[nodiscard]] bool Empty() const noexcept { return FPropertyList->Count() == 0; }
  /// The names that still follow, in the order the object defines them.
  const TStringList& PropertyList() const noexcept { return *FPropertyList.Get(); }
  /// What the last operation left the filer doing.
  TUpdateFilterState State() const noexcept { return FState; }

  void DefineProperty(const String& Name, const TReaderProc& ReadData, const TWriterProc& WriteData,
                      bool HasData) override;
  void DefineBinaryProperty(const String& Name, const TStreamProc& ReadData, const TStreamProc& WriteData,
                            bool HasData) override;
  /// There is no buffer of its own: does nothing.
  void FlushBuffer() override {}

private:
  void FilterProp(const String& Name, bool HasData);
  bool Follows(const String& Name) const { return FPropertyList->IndexOf(Name) >= 0; }
  bool PassesWriteGate(const String& Name, bool HasWriter) const;
  [[nodiscard]] bool AncestorWouldWrite();
  void WriteAncestorValues(TStream* Stream);
  void ReadIntoObject(TStream* Stream);
  void ReadBinary(const TStreamProc& ReadData);

  TObjectGuard<TStringList> FPropertyList;
  TUpdateObject* FUpdateObject = nullptr;
  TWriter* FWriter = nullptr;
  TReader* FReader = nullptr;
  bool FFiltered = false;
  TUpdateFilterState FState = usFilter;
  String FPropName;
  bool FCompare = false;
  /// Set by a probing pass when a value would be written.
  bool FWouldWrite = false;
};

} // namespace formkit
