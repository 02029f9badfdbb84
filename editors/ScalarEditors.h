//===- editors/ScalarEditors.h - The standard editor of each value kind --===//
//
// The editors the registry falls back on: one per kind of value, the nested
// editors of set elements, the date and time editors and the editor of a
// component's name. Each gives the text form of a value: what `GetValue` shows
// and what `SetValue` accepts. A write parses, checks the range, then makes one
// typed write to every pair, which ends in `Modified`; a text that cannot be
// accepted raises `EDesignPropertyError` and changes nothing.
//
// Example (the texts a user reads):
//   Align        "alClient"          TEnumProperty
//   Anchors      "[akLeft,akTop]"    TSetProperty, with one nested "True"/"False" per element
//   Tag          "-1"                TIntegerProperty
//   Font         "(TFont)"           TClassProperty, with the font's properties nested
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/PropertyEditor.h"

namespace formkit {

/// Significant digits shown for each float type: single 7, double 15, the rest 18.
FK_API int FloatPrecision(TFloatType Type) noexcept;

//===----------------------------------------------------------------------===//
// Ordinals
//===----------------------------------------------------------------------===//

/// The base of the editors of ordinal values: compares the 32-bit value over all pairs.
class FK_API TOrdinalProperty : public TPropertyEditor {
  FK_CLASS(TOrdinalProperty, TPropertyEditor)
  bool AllEqual() override;
  int GetEditLimit() override { return 63; }
};

/// Integers and integer subranges, as decimal text; an unsigned 32-bit type shows unsigned.
class FK_API TIntegerProperty : public TOrdinalProperty {
  FK_CLASS(TIntegerProperty, TOrdinalProperty)
  String GetValue() override;
  /// Raises "'%s' is not a valid integer value" for a text that is no integer and
  /// "Value must be between %d and %d" for one outside the type's range.
  void SetValue(const String& Value) override;
};

/// 8-bit characters: the character itself from 33 to 127, else "#n".
class FK_API TCharProperty : public TOrdinalProperty {
  FK_CLASS(TCharProperty, TOrdinalProperty)
  String GetValue() override;
  /// Empty text is 0, one character its code, "#n" the code n. Raises "Invalid property
  /// value" for other text and "Value must be between %d and %d" outside the type's range.
  void SetValue(const String& Value) override;
};

/// 16-bit characters. The plain read shows "#n" outside 33 to 127; the wide read shows
/// every character from 33 up as itself.
class FK_API TWideCharProperty : public TCharProperty, public IWideProperty {
  FK_CLASS(TWideCharProperty, TCharProperty)
  FK_INTERFACES(IWideProperty)
  WideString GetValueW() override;
  bool GetEditValueW(WideString& Value) override { return TPropertyEditor::GetEditValueW(Value); }
  void SetValueW(const WideString& Value) override { SetValue(Utf16ToUtf8(Value)); }
};

/// Enumerations, by enumerator name, with the names offered as a value list.
class FK_API TEnumProperty : public TOrdinalProperty {
  FK_CLASS(TEnumProperty, TOrdinalProperty)
  TPropertyAttributes GetAttributes() override;
  /// A stored value beyond the type's range shows as the last name.
  String GetValue() override;
  /// The names in ascending order; a type with a negative minimum offers those of 0 and 1.
  void GetValues(const TGetStrProc& Proc) override;
  /// Raises "Invalid property value" for a name the type does not have.
  void SetValue(const String& Value) override;
};

/// Booleans: an enumeration of "False" and "True".
class FK_API TBoolProperty : public TEnumProperty {
  FK_CLASS(TBoolProperty, TEnumProperty)
};

/// Sets, as "[a,b]" without blanks; edited through one nested editor per element.
class FK_API TSetProperty : public TOrdinalProperty {
  FK_CLASS(TSetProperty, TOrdinalProperty)
  TPropertyAttributes GetAttributes() override;
  void GetProperties(const TGetPropProc& Proc) override;
  String GetValue() override;
};

//===----------------------------------------------------------------------===//
// Nested editors
//===----------------------------------------------------------------------===//

/// An editor that serves the pairs of a parent editor. It keeps the parent alive while
/// it lives, since the pairs are the parent's.
class FK_API TNestedProperty : public TPropertyEditor {
  FK_CLASS(TNestedProperty, TPropertyEditor)

protected:
  /// Runs the constructor for `Parent`'s designer and takes over its pairs.
  void CreateNested(TPropertyEditor& Parent);

private:
  IPtr<IProperty> FParent;
};

/// One element of a set: "True" when its bit is in the first pair's set.
class FK_API TSetElementProperty : public TNestedProperty {
  FK_CLASS(TSetElementProperty, TNestedProperty)
  /// A new editor of element `Element` (its ordinal value) of `Parent`'s set.
  [[nodiscard]] static IPtr<IProperty> CreateFor(TPropertyEditor& Parent, int Element);

  /// Compares only this element's bit over all pairs.
  bool AllEqual() override;
  TPropertyAttributes GetAttributes() override;
  String GetName() override;
  String GetValue() override;
  void GetValues(const TGetStrProc& Proc) override;
  /// Sets the bit for "True" (without regard to case), clears it for any other text, and
  /// writes the first pair's set so changed to every pair.
  void SetValue(const String& Value) override;
  /// With a declared default, whether the bit is as in the default.
  bool GetIsDefault() override;

protected:
  int FElement = 0;
  /// `FElement` minus the minimum of the element type: the bit in the stored set.
  int FBit = 0;
};

//===----------------------------------------------------------------------===//
// Numbers, text, objects and dates
//===----------------------------------------------------------------------===//

/// 64-bit integers, as signed decimal text, without a range check.
class FK_API TInt64Property : public TPropertyEditor {
  FK_CLASS(TInt64Property, TPropertyEditor)
  bool AllEqual() override;
  int GetEditLimit() override { return 63; }
  String GetValue() override;
  /// Raises "'%s' is not a valid integer value".
  void SetValue(const String& Value) override;
};

/// Floating-point numbers in the general format of the global format settings.
class FK_API TFloatProperty : public TPropertyEditor {
  FK_CLASS(TFloatProperty, TPropertyEditor)
  /// Exact equality: values that print alike may differ.
  bool AllEqual() override;
  String GetValue() override;
  /// Raises "'%s' is not a valid floating point value".
  void SetValue(const String& Value) override;
};

/// Text properties.
class FK_API TStringProperty : public TPropertyEditor {
  FK_CLASS(TStringProperty, TPropertyEditor)
  /// Exact, case-sensitive comparison.
  bool AllEqual() override;
  /// A short string's declared maximum; 2047 for the other text kinds.
  int GetEditLimit() override;
  String GetValue() override { return GetStrValue(); }
  void SetValue(const String& Value) override { SetStrValue(Value); }
};

/// A component's name: never shown for several components, nor beneath a reference.
class FK_API TComponentNameProperty : public TStringProperty {
  FK_CLASS(TComponentNameProperty, TStringProperty)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paNotNestable}; }
  int GetEditLimit() override { return 63; }
};

/// Wide text properties: only the wide form of `SetValue` stores.
class FK_API TWideStringProperty : public TPropertyEditor, public IWideProperty, public IWideProperty10 {
  FK_CLASS(TWideStringProperty, TPropertyEditor)
  FK_INTERFACES(IWideProperty, IWideProperty10)
  bool AllEqual() override;
  String GetValue() override { return GetStrValue(); }
  WideString GetValueW() override { return GetWideStrValue(); }
  bool GetEditValueW(WideString& Value) override { return TPropertyEditor::GetEditValueW(Value); }
  void SetValueW(const WideString& Value) override { SetWideStrValue(Value); }
  WideString GetNameW() override { return Utf8ToUtf16(GetName()); }
  /// Offers nothing.
  void GetValuesW(const TGetWideStrProc&) override {}
};

/// Object properties: "(TypeName)", with the held objects' properties nested (no events).
class FK_API TClassProperty : public TPropertyEditor {
  FK_CLASS(TClassProperty, TPropertyEditor)
  TPropertyAttributes GetAttributes() override;
  /// The properties the objects held by the pairs share; nil objects are left out.
  void GetProperties(const TGetPropProc& Proc) override;
  String GetValue() override;
};

/// The date part of a date-time value; empty for 0.
class FK_API TDateProperty : public TPropertyEditor {
  FK_CLASS(TDateProperty, TPropertyEditor)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paMultiSelect, paRevertable}; }
  String GetValue() override;
  /// Empty text is 0; raises "'%s' is not a valid date".
  void SetValue(const String& Value) override;
};

/// The time part of a date-time value; empty for 0.
class FK_API TTimeProperty : public TPropertyEditor {
  FK_CLASS(TTimeProperty, TPropertyEditor)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paMultiSelect, paRevertable}; }
  String GetValue() override;
  /// Empty text is 0; raises "'%s' is not a valid time".
  void SetValue(const String& Value) override;
};

/// A date-time value; empty for 0.
class FK_API TDateTimeProperty : public TPropertyEditor {
  FK_CLASS(TDateTimeProperty, TPropertyEditor)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paMultiSelect, paRevertable}; }
  String GetValue() override;
  /// Empty text is 0; raises "'%s' is not a valid date and time".
  void SetValue(const String& Value) override;
};

} // namespace formkit
