//===- frameworks/kiln/Kiln.h - Starting and stopping the framework ------===//
//
// `InitializeKiln` registers every class of the framework, so a reader finds
// them by name, in a class group of their own represented by `TControl`, and
// makes that group the current one. `FinalizeKiln` undoes it. Both may be called
// more than once; only the first start and the matching stop count.
//
// Example:
//   InitializeKiln();
//   TComponent* Form = ReadRoot(Stream);   // finds TForm, TButton, ...
//   FinalizeKiln();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnClipbrd.h"
#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnStdCtrls.h"

namespace formkit {

/// Registers the classes in the framework's class group and activates that group.
/// Calls nest: each needs a matching `FinalizeKiln`.
FK_API void InitializeKiln();
/// On the last matching call: unregisters the classes, gives back the class group that
/// was current before, and frees the screen and the clipboard.
FK_API void FinalizeKiln();
/// True between the first `InitializeKiln` and the last `FinalizeKiln`.
FK_API bool KilnInitialized() noexcept;

/// The components a palette offers to place on a module: the registered classes
/// without the abstract bases, the module classes (forms, frames, data modules) and
/// the actions, which their lists make. In the order of the framework's pages.
[[nodiscard]] FK_API std::vector<TClass> KilnPaletteClasses();

} // namespace formkit
