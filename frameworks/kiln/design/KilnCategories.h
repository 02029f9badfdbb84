//===- frameworks/kiln/design/KilnCategories.h - Categories of Kiln's properties ===//
//
// The inspector's categories for the properties and events Kiln publishes.
//
// Example:
//   RegisterKilnCategories();   // the package, as it loads
//   IsPropertyInCategory("Layout", TButton::StaticClass(), "Left");   // true
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

namespace formkit {

/// Puts Kiln's properties and events into the inspector's categories (layout, visual,
/// input, mouse, help, localizable, linkage, data, behaviour). A name may stand in more
/// than one; what none takes, such as a component's name, stays miscellaneous.
FK_API void RegisterKilnCategories();

} // namespace formkit
