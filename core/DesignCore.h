//===- core/DesignCore.h - Start and stop of the design core -------------===//
//
// The design core starts its units in a fixed order and stops them in the
// reverse order. Later parts of the library (the editor registries, the
// structure tree, the tool services) join by adding steps to a stage, so the
// order is kept without editing the core:
//
//   Registries            registries that set their registration hooks
//   Core                  the lists, `Designers`, custom modules, notification
//                         hooks, the global events, top-level windows
//   DefaultRegistrations  the default editors and tree nodes
//
// Example:
//   AddDesignCoreStep(TCoreStage::Registries, "PropertyEditors", &StartEditors, &StopEditors);
//   StartDesignCore();
//   ...
//   StopDesignCore();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <functional>

namespace formkit {

enum class TCoreStage : std::uint8_t { Registries, Core, DefaultRegistrations };

/// Adds a named step to a stage, after the steps already there. `Stop` may be null.
/// A step added while the core runs starts at once.
FK_API void AddDesignCoreStep(TCoreStage Stage, String Name, std::function<void()> Start,
                              std::function<void()> Stop);
/// Removes the step named `Name` (a package that unloads); if it has started, it stops first.
FK_API void RemoveDesignCoreStep(const String& Name);
/// Starts every step in stage order, then in the order of addition. A second call
/// while running does nothing.
FK_API void StartDesignCore();
/// Stops the steps in the reverse order of their start. Nothing when not running.
FK_API void StopDesignCore() noexcept;
FK_API bool DesignCoreRunning() noexcept;
/// The names of the steps in the order they start, for diagnostics.
FK_API std::vector<String> DesignCoreStepNames();

} // namespace formkit
