//===- core/EditorGroups.h - Design package groups -----------------------===//
//
// A design package loads under a group number (`CurrentGroup`); when it
// unloads, every registry subscribed here drops what that group registered.
//
// Example:
//   NotifyGroupChange(&DropMyRegistrations);
//   ...
//   NotifyGroupChangeSubscribers(Group);   // each subscriber, last to first
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

namespace formkit {

/// Told the number of a group whose package goes away.
using TGroupChangeProc = void (*)(int Group);

/// Subscribes `Proc` at the end of the list; a repeat first leaves its old place.
FK_API void NotifyGroupChange(TGroupChangeProc Proc);
/// Unsubscribes `Proc`; nothing when absent.
FK_API void UnnotifyGroupChange(TGroupChangeProc Proc);
/// Calls every subscriber with `Group`, from the last to the first.
FK_API void NotifyGroupChangeSubscribers(int Group);

} // namespace formkit
