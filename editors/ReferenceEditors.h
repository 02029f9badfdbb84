//===- editors/ReferenceEditors.h - Editors of references, events, variants ===//
//
// The editors of the values that live partly outside the object: a reference to
// another component or to an interface it implements, an event bound to a method
// of the module's source, a variant, and a collection. The registry chooses them
// for their kinds and types; each answers, for now, with the behaviour of the base
// editor (the text of `srUnknown`, a write that changes nothing), so that every
// published property of a class is listed.
//
// Example:
//   GetEditorClass(GetPropInfo(Label, "FocusControl"), Label);  // TComponentProperty
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ScalarEditors.h"

namespace formkit {

/// References to components.
class FK_API TComponentProperty : public TPropertyEditor {
  FK_CLASS(TComponentProperty, TPropertyEditor)
};

/// References to interfaces that components implement.
class FK_API TInterfaceProperty : public TComponentProperty {
  FK_CLASS(TInterfaceProperty, TComponentProperty)
};

/// Events, bound to methods of the designed class.
class FK_API TMethodProperty : public TPropertyEditor {
  FK_CLASS(TMethodProperty, TPropertyEditor)
};

/// Variants.
class FK_API TVariantProperty : public TPropertyEditor {
  FK_CLASS(TVariantProperty, TPropertyEditor)
};

/// Collections.
class FK_API TCollectionProperty : public TClassProperty {
  FK_CLASS(TCollectionProperty, TClassProperty)
};

} // namespace formkit
