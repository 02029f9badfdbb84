//===- core/DesignCore.h - Start and stop of the design core -------------===//
//
// The design core starts its units in a fixed order and stops them in exactly
// the reverse order. Steps stand in stages; within a stage they start in the
// order they were added. Later parts of the library (the editor registries, the
// structure tree, the tool services) join by adding steps to a stage, so the
// order is kept without editing the core. The start, stage by stage:
//
//   Registries            registries that set their registration hooks
//   Core                  the core's own units, in this order:
//     DesignNotifications       the list of design notification listeners
//     NoIconClasses             the no-icon class list, and `RegisterNoIconProc`
//     Designers                 the one `TDesigners`: `Designers()` is not null
//     CustomModules             `RegisterCustomModuleProc`, and the handler that drops
//                               a class group's registrations when its package goes
//     DesignNotificationHooks   `RegisterDesignNotificationProc` and its unregister
//     Events                    the four global events (`EvRootActivatedEvent`, ...)
//     TopLevels                 the top-level handlers, `GetTopLevelComponentFunc`
//     StringsFileSystem         nothing yet: `InitializeDesigners` registers it
//   DefaultRegistrations  the default editors and tree nodes
//
// The stop walks the started steps backwards: the strings file system is
// unregistered, `GetTopLevelComponentFunc` cleared, the events freed (null
// again), the notification hooks cleared and the listener and no-icon lists
// freed, the custom-module registrations dropped, and `Designers()` is null last.
// A step that fails to start stops the steps before it and passes its exception on.
//
// A host's whole session, in order:
//
//   AddDesignCoreStep(TCoreStage::Registries, "PropertyEditors",   // 1. late parts join
//                     &StartEditors, &StopEditors);
//   StartDesignCore();                          // 2. the units start, as above
//   RegisterInitializeDesigner(&InitMyDesigner); // 3. each framework's designer package
//   InitializeDesigners(Environment);           // 4. designers register with Designers();
//                                               //    the strings file system registers
//   IPtr<IRoot> Root = Designers()->DesignerFromExtension(".kfm")
//                          ->CreateRoot(Module, "Unit1.kfm", false, "Form1", "", "", nullptr, "");
//   ...                                         // 5. design, save
//   Root->Close();                              // 6. the host closes every module,
//   Designers()->UnregisterDesigner(Designer);  //    lets every designer go,
//   StopDesignCore();                           // 7. and the units stop in reverse
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <functional>

namespace formkit {

/// The stages of the start, in the order they run.
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
/// Whether the core has started and not stopped.
FK_API bool DesignCoreRunning() noexcept;
/// The names of the steps in the order they start, for diagnostics.
FK_API std::vector<String> DesignCoreStepNames();

} // namespace formkit
