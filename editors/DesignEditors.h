//===- editors/DesignEditors.h - Property and component editing ----------===//
//
// Everything a design package writes against to extend the inspector: the
// registries and the enumeration of a selection's properties, the property editor
// base, the standard editors, selection editors and component guidelines.
//
// Example (a package's editor for a colour property):
//   class TMyColorProperty : public TIntegerProperty {
//     FK_CLASS(TMyColorProperty, TIntegerProperty)
//     String GetValue() override;               // "clRed" rather than "255"
//   };
//   RegisterPropertyEditor(TypeInfo_TColor(), nullptr, "", TMyColorProperty::StaticClass());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ComponentEditors.h"
#include "editors/ComponentGuidelines.h"
#include "editors/CustomModule.h"
#include "editors/EditorRegistry.h"
#include "editors/PropertyEditor.h"
#include "editors/ReferenceEditors.h"
#include "editors/ScalarEditors.h"
#include "editors/SelectionEditors.h"
