//===- core/DesignNotifications.h - Listeners of every design surface ----===//
//
// The one list of `IDesignNotification` listeners that tool windows join with
// `RegisterDesignNotification`, and the broadcasts that reach them. Broadcasts
// walk from the last listener to the first, so a listener may leave during the
// call; `DesignNotificationDesignerClosed` walks a copy in order instead and
// skips whoever left meanwhile. Exceptions are not caught: a listener that
// raises stops the walk.
//
// Example:
//   DesignNotificationSelectionChanged(Designer, Selection);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

FK_API void DesignNotificationItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem);
FK_API void DesignNotificationItemInserted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem);
FK_API void DesignNotificationItemsModified(const IPtr<IDesigner>& ADesigner);
FK_API void DesignNotificationSelectionChanged(const IPtr<IDesigner>& ADesigner,
                                               const IPtr<IDesignerSelections>& ASelection);
FK_API void DesignNotificationDesignerOpened(const IPtr<IDesigner>& ADesigner, bool AResurrecting);
FK_API void DesignNotificationDesignerClosed(const IPtr<IDesigner>& ADesigner, bool AGoingDormant);
/// Reaches only listeners that answer to `IDesignNotificationEx`.
FK_API void DesignNotificationDescendantUpdated(const IPtr<IDesigner>& ADesigner);
/// Reach only listeners that answer to `IDesignNotificationViews`.
FK_API void DesignNotificationViewAdded(const IPtr<IDesigner>& ADesigner, const String& ViewName);
FK_API void DesignNotificationViewRemoved(const IPtr<IDesigner>& ADesigner, const String& ViewName);

/// The listeners now registered, last first: for `HideWindows`, `ShowWindows` and tests.
FK_API std::vector<IPtr<IDesignNotification>> DesignNotificationListeners();

/// True for null and for an instance of a class passed to `RegisterNoIcon`.
FK_API bool IsNoIconComponent(TComponent* Component);

/// The listener and no-icon lists' start and stop (the core's start and stop call them).
FK_API void InitializeDesignNotifications();
FK_API void InitializeNoIconClasses();
FK_API void InstallDesignNotificationHooks();
FK_API void FinalizeDesignNotifications() noexcept;

} // namespace formkit
