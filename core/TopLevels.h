//===- core/TopLevels.h - Components that live in top-level windows ------===//
//
// Handlers that tell which component a top-level window shows, how to bring it
// forward and what its caption is; and `TopLevelComponent`, which finds the
// component of the active or topmost usable window. The platform's window list
// is reached through `TWindowList`, which a host or framework fills.
//
// Example:
//   RegisterHandler(MyFrameworkHandler);
//   TComponent* Form = TopLevelComponent(nullptr);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Lists.h"

namespace formkit {

/// A platform window handle; 0 is no window.
using HWND = std::uintptr_t;

/// What a widget framework knows of its top-level windows.
struct FK_API ITopLevelsHandler : IInterface {
  FK_INTERFACE(ITopLevelsHandler, IInterface, "{FF75DEB8-3299-5620-9678-1CF643033037}")
  /// The component shown by `Wnd`, or null when the window is not the framework's.
  virtual TComponent* ComponentFromWindow(HWND Wnd) = 0;
  /// Brings the component's window forward; false when it is not the framework's.
  virtual bool ActivateTopLevelComponent(TComponent* Component) = 0;
  /// The caption of the component's window; false when unknown.
  virtual bool CaptionFromComponent(TComponent* Component, String& Caption) = 0;
  virtual bool IsComponentDesigner(TComponent* Component) = 0;
};

FK_API void RegisterHandler(const IPtr<ITopLevelsHandler>& Handler);
FK_API void UnregisterHandler(const IPtr<ITopLevelsHandler>& Handler);

/// Handlers in order until one returns true.
FK_API bool ActivateTopLevelComponent(TComponent* Component);
/// Handlers in order until one gives a non-empty caption; empty otherwise.
FK_API String CaptionFromComponent(TComponent* Component);
/// True when any handler says so.
FK_API bool IsComponentDesigner(TComponent* Component);
/// The component of a platform window, asked of the handlers in order; null when none knows it.
FK_API TComponent* ComponentFromWindow(HWND Wnd);
/// The component of the active window when it has one other than `Exclude`; otherwise the
/// first window in z-order that is visible, not topmost and shows a component other than
/// `Exclude`; null when there is none.
FK_API TComponent* TopLevelComponent(TComponent* Exclude);
/// Left empty: no list of top-level components is kept.
FK_API std::vector<TComponent*> TopLevelComponents();

/// The platform's top-level windows as the host or framework reports them.
class FK_API TWindowList {
public:
  struct Window {
    HWND Handle = 0;
    bool Visible = true;
    bool Topmost = false;
  };
  /// The windows in z-order, frontmost first.
  static void SetWindows(std::vector<Window> Windows);
  static const std::vector<Window>& Windows();
  /// The active window; 0 for none.
  static void SetActiveWindow(HWND Wnd);
  static HWND ActiveWindow();
};

/// The hook through which property editors find the top-level component; the core
/// installs `TopLevelComponent` when it starts and clears it when it stops.
FK_API extern std::function<TComponent*(TComponent* Exclude)> GetTopLevelComponentFunc;

/// Creates and frees the handler list and sets the hook (the core's start and stop).
FK_API void InitializeTopLevels();
FK_API void FinalizeTopLevels() noexcept;

} // namespace formkit
