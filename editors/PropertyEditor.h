//===- editors/PropertyEditor.h - The base of every property editor ------===//
//
// `TPropertyEditor` is the object through which an inspector reads, shows and
// changes one property of one or more selected objects. It serves a list of
// (instance, property) pairs: reads take the first pair, writes go to all of them
// and end in one `Modified` of the designer. Descendants give the text form of a
// value by overriding `GetValue` and `SetValue`.
//
// The order in which editors are driven:
//
//   IPtr<TBasePropertyEditor> E = NewFromClass<TBasePropertyEditor>(Class, Designer, 2);
//   E->SetPropEntry(0, Button1, LeftProp);   // every pair, before anything else
//   E->SetPropEntry(1, Button2, LeftProp);
//   E->Initialize();                         // once: now the pairs may be read
//   IPtr<IProperty> P = QueryAs<IProperty>(E);
//   P->SetValue("16");                       // both buttons; one Modified
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// Texts and errors
//===----------------------------------------------------------------------===//

/// What a value that has no text form of its own shows.
FK_RESOURCESTRING(srUnknown, "(Unknown)");
/// What a write-only property shows.
FK_RESOURCESTRING(sNotAvailable, "(Not available)");

/// Raised by an editor for a text it cannot accept; the property keeps its value.
FK_EXCEPTION(EDesignPropertyError, ENonAIRException);

//===----------------------------------------------------------------------===//
// TPropertyEditor
//===----------------------------------------------------------------------===//

/// One served pair: an object and one of its properties. Holds plain references; the
/// editor must not outlive the objects it was built for.
struct TInstProp {
  TPersistent* Instance = nullptr;
  PPropInfo PropInfo = nullptr;
};

/// The base of all property editors: the pairs, typed access to the property's value,
/// the comparison with what an ancestor module would store. Counted; made through the
/// virtual constructor of `TBasePropertyEditor`.
class FK_API TPropertyEditor : public TBasePropertyEditor, public IProperty70, public IPropertyKind {
  FK_CLASS(TPropertyEditor, TBasePropertyEditor)
  FK_INTERFACES(IProperty70, IPropertyKind)

  // Construction and the pairs
  /// Keeps the designer (may be null) and makes room for `APropCount` pairs. A descendant's
  /// constructor runs before any pair is set and must not read the property.
  void Create(const IPtr<IDesigner>& ADesigner, int APropCount) override;
  /// The first moment a descendant may read its pairs; called once, after all are set.
  void Initialize() override {}
  /// Sets pair `Index`, which the caller keeps below `PropCount()`.
  void SetPropEntry(int Index, TPersistent* AInstance, PPropInfo APropInfo) override;

  // What descendants override
  /// The 32-bit ordinal value of the first pair.
  virtual std::int32_t GetOrdValue();
  /// True when the value would not be written to the module's stream: it equals the
  /// class's default or the ancestor module's value. Not reentrant on one editor.
  bool GetIsDefault() override;
  void Activate() override {}
  /// True only for one pair; descendants compare the value over all pairs.
  bool AllEqual() override;
  /// True when the property has a write accessor.
  bool AutoFill() override;
  /// Steps to the next of the offered values, wrapping at the end.
  void Edit() override;
  TPropertyAttributes GetAttributes() override;
  int GetEditLimit() override { return 2047; }
  String GetName() override;
  void GetProperties(const TGetPropProc&) override {}
  PPropInfo GetPropInfo() override;
  /// The text of `srUnknown`.
  String GetValue() override;
  /// `GetValue` in wide form.
  virtual WideString GetValueW();
  void GetValues(const TGetStrProc&) override {}
  /// Ignores the text: a property without a text form is harmless to write.
  void SetValue(const String&) override {}
  /// The wide form of `SetValue`; ignores the text.
  virtual void SetValueW(const WideString&) {}

  // The inspector's safe operations
  bool HasInstance(TPersistent* Instance) override;
  /// The value and whether it may be edited; a failing read gives its message in
  /// parentheses ("(Not available)" for a write-only property) and false.
  bool GetEditValue(String& Value) override;
  /// The wide form of `GetEditValue`.
  virtual bool GetEditValueW(WideString& Value);
  PTypeInfo GetPropType() override;
  TTypeKind GetKind() override;
  /// Has the designer put each pair back to its inherited value; no `Modified` of its own.
  void Revert() override;
  /// False when a component that checks property availability refuses the read.
  bool ValueAvailable() override;

  // Typed reads: the first pair, or pair `Index`
  double GetFloatValue() { return GetFloatValueAt(0); }
  double GetFloatValueAt(int Index);
  std::int64_t GetInt64Value() { return GetInt64ValueAt(0); }
  std::int64_t GetInt64ValueAt(int Index);
  TMethod GetMethodValue() { return GetMethodValueAt(0); }
  TMethod GetMethodValueAt(int Index);
  std::int32_t GetOrdValueAt(int Index);
  String GetStrValue() { return GetStrValueAt(0); }
  String GetStrValueAt(int Index);
  WideString GetWideStrValue() { return GetWideStrValueAt(0); }
  WideString GetWideStrValueAt(int Index);
  TVariant GetVarValue() { return GetVarValueAt(0); }
  TVariant GetVarValueAt(int Index);
  IPtr<IInterface> GetIntfValue() { return GetIntfValueAt(0); }
  IPtr<IInterface> GetIntfValueAt(int Index);

  // Typed writes to every pair, then one `Modified`; no rollback when a setter raises
  void SetFloatValue(double Value);
  void SetInt64Value(std::int64_t Value);
  void SetMethodValue(const TMethod& Value);
  void SetOrdValue(std::int32_t Value);
  /// Skips pairs whose property has no write accessor.
  void SetStrValue(const String& Value);
  /// Skips pairs whose property has no write accessor.
  void SetWideStrValue(const WideString& Value);
  void SetVarValue(const TVariant& Value);
  void SetIntfValue(const IPtr<IInterface>& Value);

  // Helpers
  /// The instance of pair `Index`.
  TPersistent* GetComponent(int Index) const { return FPropList[Index].Instance; }
  /// `GetValue` when all pairs agree, else the empty string.
  String GetVisualValue();
  /// The designer's private directory, or empty without a designer.
  String GetPrivateDirectory();
  /// Tells the designer of a change; nothing without a designer.
  void Modified();
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }
  int PropCount() const noexcept { return FPropCount; }

protected:
  /// Runs `Write(Instance, PropInfo)` on every pair from the first, then `Modified`.
  template <class F> void WriteAllPairs(F&& Write) {
    for (int I = 0; I < FPropCount; ++I) Write(FPropList[I].Instance, FPropList[I].PropInfo);
    Modified();
  }
  /// Shares the pairs of `Parent`, which owns them (nested editors).
  void SharePairsOf(TPropertyEditor& Parent) noexcept;

  IPtr<IDesigner> FDesigner;
  /// The pairs: `FOwnedPropList`, or the parent's for a nested editor (a back reference).
  TInstProp* FPropList = nullptr;
  int FPropCount = 0;

private:
  // The search for the ancestor's counterpart, during one `GetIsDefault`.
  bool IsDefaultAgainstAncestor(TPersistent* Instance, PPropInfo Prop);
  void FindAncestorOf(TComponent* Instance);
  void WriteComponentSimulation(TComponent* Component);
  void GetLookupInfo(TPersistent*& Ancestor, TComponent*& Root, TComponent*& LookupRoot,
                     TComponent*& RootAncestor);

  std::unique_ptr<TInstProp[]> FOwnedPropList;
  /// Working state of `GetIsDefault`; meaningful only during one call.
  std::vector<TComponent*>* FAncestorList = nullptr;
  TComponent* FRoot = nullptr;
  TPersistent* FAncestor = nullptr;
  TComponent* FRootAncestor = nullptr;
  TComponent* FLookingFor = nullptr;
  bool FDoneLooking = false;
};

} // namespace formkit
