//===- editors/ReferenceEditors.h - Editors of references, events, variants ===//
//
// The editors of the values that live partly outside the object: a reference to
// another component or to an interface it implements, an event bound to a method
// of the module's source, a variant, and a collection. Their text form is a name,
// and they go through the designer (`IDesigner`) for everything that turns a name
// into a thing: the component of a name, the methods of a signature, a new handler.
//
// Example (what a double click on an empty OnClick of Button1 does):
//   IPtr<IProperty> OnClick = ...;      // from GetComponentProperties
//   OnClick->Edit();                    // the host creates and shows "Button1Click"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ScalarEditors.h"

#include <functional>

namespace formkit {

//===----------------------------------------------------------------------===//
// Texts
//===----------------------------------------------------------------------===//

FK_RESOURCESTRING(SCannotCreateName, "Cannot create a method for an unnamed component");
FK_RESOURCESTRING(SNull, "(Null)");
FK_RESOURCESTRING(SError, "(Error)");
FK_RESOURCESTRING(SDispatch, "(Dispatch)");
FK_RESOURCESTRING(SUnknown, "(Unknown)");
FK_RESOURCESTRING(SString, "String");
FK_RESOURCESTRING(SUnknownType, "Unknown Type");

//===----------------------------------------------------------------------===//
// References
//===----------------------------------------------------------------------===//

/// References to components, shown by the name the designer gives them ("Form2.Button1"
/// for one of a linked module). A reference held by every selected object opens onto the
/// referenced component's properties, seen through its own module's designer.
class FK_API TComponentProperty : public TPropertyEditor, public IReferenceProperty, public IShowReferenceProperty {
  FK_CLASS(TComponentProperty, TPropertyEditor)
  FK_INTERFACES(IReferenceProperty, IShowReferenceProperty)

  /// The component the first pair refers to, or null.
  TComponent* GetComponentReference() override;
  /// Whether the host should show the reference at all: not for a component owned inside
  /// another module's component, unless that owner is a data module.
  bool ShowReferenceProperty() override;
  /// The referenced component of every pair when they all agree and it is on a design
  /// surface; else null.
  virtual IPtr<IDesignerSelections> GetSelections();

  /// True when every pair refers to the same component, and that component is on a
  /// design surface.
  bool AllEqual() override;
  /// Ctrl with the left mouse button selects the referenced component; anything else
  /// steps through the values.
  void Edit() override;
  TPropertyAttributes GetAttributes() override;
  int GetEditLimit() override { return 127; }
  void GetProperties(const TGetPropProc& Proc) override;
  String GetValue() override;
  /// The names of the components of the property's class in this and linked modules.
  void GetValues(const TGetStrProc& Proc) override;
  /// Empty text clears the reference. Raises "Invalid property value" for a name that is
  /// no component of the property's class.
  void SetValue(const String& Value) override;

  /// Keeps what must not show beneath a reference (a component's name) out of it.
  static bool FilterFunc(const IPtr<IProperty>& ATestEditor);

protected:
  /// Whether the designer of `Component`'s module answers as `IDesigner`.
  static bool IsOnDesignSurface(TComponent* Component);
};

/// References to interfaces that components implement; the names are the components'.
class FK_API TInterfaceProperty : public TComponentProperty {
  FK_CLASS(TInterfaceProperty, TComponentProperty)

  /// The component behind `AInterface`, or null.
  static TComponent* GetComponent(const IPtr<IInterface>& AInterface);
  TComponent* GetComponentReference() override;
  IPtr<IDesignerSelections> GetSelections() override;
  bool AllEqual() override;
  /// The names of the components whose reference answers to the property's interface.
  void GetValues(const TGetStrProc& Proc) override;
  /// Empty text clears the reference. Raises "Invalid property value" for a name that is no
  /// component, or one whose reference does not answer to the property's interface.
  void SetValue(const String& Value) override;

private:
  void ReceiveComponentNames(const String& S);
  /// Whether `Component`'s reference answers to the property's interface.
  bool Answers(TComponent* Component);
  /// The receiver of a running `GetValues`; empty at other times.
  TGetStrProc FGetValuesStrProc;
};

//===----------------------------------------------------------------------===//
// Events
//===----------------------------------------------------------------------===//

/// Events, bound to methods of the designed class by name. Writing a new name creates
/// the handler in the module's source; writing another case of the same name, or a
/// name no method has, renames the bound one. Without a designer there is no source:
/// writes and edits do nothing.
class FK_API TMethodProperty : public TPropertyEditor, public IMethodProperty {
  FK_CLASS(TMethodProperty, TPropertyEditor)
  FK_INTERFACES(IMethodProperty)

  /// False when an object of the selection has no name path: no handler can be named.
  virtual bool AllNamed();
  /// The name proposed for a new handler: the object's name ("Button1", or the root's
  /// class name without its "T") followed by the event's name without "On".
  virtual String GetFormMethodName();
  /// The event's name less a leading "On" in either case.
  String GetTrimmedEventName();

  /// True for one pair; else all pairs hold the same method.
  bool AllEqual() override;
  /// Shows the bound handler; an empty event, or one bound to an inherited handler, gets a
  /// new handler of the proposed name first. Raises "Cannot create a method for an
  /// unnamed component".
  void Edit() override;
  TPropertyAttributes GetAttributes() override;
  int GetEditLimit() override { return 63; }
  String GetValue() override;
  /// The methods of the module that fit the event.
  void GetValues(const TGetStrProc& Proc) override;
  void SetValue(const String& Value) override;

private:
  /// Lets a new handler call what the event was bound to before, in another component.
  void CheckChainCall(const String& MethodName, const TMethod& Method);
  /// Raises `SCannotCreateName` unless every object has a name path.
  void RequireAllNamed();
};

//===----------------------------------------------------------------------===//
// Variants and collections
//===----------------------------------------------------------------------===//

/// Variants: the value as text, and a nested "Type" row to change its type. A text keeps
/// the variant's type when it reads back the same through it, else the value becomes a
/// string.
class FK_API TVariantProperty : public TPropertyEditor {
  FK_CLASS(TVariantProperty, TPropertyEditor)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paSubProperties, paMultiSelect}; }
  void GetProperties(const TGetPropProc& Proc) override;
  String GetValue() override;
  void SetValue(const String& Value) override;
};

/// The "Type" row beneath a variant.
class FK_API TVariantTypeProperty : public TNestedProperty {
  FK_CLASS(TVariantTypeProperty, TNestedProperty)
  /// A new row for `Parent`'s variant.
  [[nodiscard]] static IPtr<IProperty> CreateFor(TPropertyEditor& Parent);

  bool AllEqual() override;
  TPropertyAttributes GetAttributes() override {
    return TPropertyAttributes{paValueList, paMultiSelect, paSortList};
  }
  String GetName() override { return "Type"; }
  String GetValue() override;
  void GetValues(const TGetStrProc& Proc) override;
  /// Raises "Unknown Type" for a name that is no variant type.
  void SetValue(const String& Value) override;
};

/// The names of variant type codes 0 to 20; null where a code has none.
FK_API const char* VariantTypeName(int Code) noexcept;

/// What a collection editor lets the user do with the items.
FK_ENUM(TColOption, std::uint8_t, coAdd, coDelete, coMove)
using TColOptions = TSet<TColOption>;

/// Opens the collection editor window of class `EditorClass` for `Collection`, the
/// property `PropertyName` of `Component`, or brings the open one to the front. Set by
/// the framework package that holds the window; empty while none is loaded.
using TShowCollectionEditorProc =
    std::function<void(const IPtr<IDesigner>& Designer, TClass EditorClass, TComponent* Component,
                       TCollection* Collection, const String& PropertyName, TColOptions Options)>;
FK_API extern TShowCollectionEditorProc ShowCollectionEditorProc;
/// The window class the editor opens by default; set with `ShowCollectionEditorProc`.
FK_API extern TClass DefaultCollectionEditorClass;

/// Collections: a dialog of the items, which the collection editor window shows.
class FK_API TCollectionProperty : public TClassProperty {
  FK_CLASS(TCollectionProperty, TClassProperty)
  TPropertyAttributes GetAttributes() override { return TPropertyAttributes{paDialog, paReadOnly, paKiln}; }
  /// Opens the editor window for the collection of the first object, named after the
  /// component that holds it (found up the owners).
  void Edit() override;
  /// The window's class: `DefaultCollectionEditorClass` unless a descendant says another.
  virtual TClass GetEditorClass();
  /// All three operations unless a descendant says fewer.
  virtual TColOptions GetColOptions();
};

} // namespace formkit
