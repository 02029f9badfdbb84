//===- editors/ReferenceEditors.cpp - Editors of references, events, variants ===//
#include "editors/ReferenceEditors.h"

#include "editors/ScalarEditors.h"

namespace formkit {

FK_IMPLEMENT(TComponentProperty, "DesignEditors") {}
FK_IMPLEMENT(TInterfaceProperty, "DesignEditors") {}
FK_IMPLEMENT(TMethodProperty, "DesignEditors") {}
FK_IMPLEMENT(TVariantProperty, "DesignEditors") {}
FK_IMPLEMENT(TCollectionProperty, "DesignEditors") {}

} // namespace formkit
