//===- host/DesktopRender.h - Pictures of a saved desktop layout ----------===//
//
// Draws what a desktop file lays out, so that a person sees the layout instead
// of reading its sections. The file is loaded as the environment loads it: a
// window class is registered for each section (a tab host for a section that
// lists "TabDockClients", a join host for one that lists "DockClients", a plain
// dockable tool window for any other, named and captioned after its section),
// the registry creates the windows inside one load batch, the hosts dock their
// clients, and every placement is scaled to the monitors given. Then the
// picture shows each monitor with its work area and task bar, each visible
// window with its frame and caption, the hosts with their tab strips, dock
// captions and splitters, and minimised windows as buttons on the task bar.
//
// Monitors are written as `WIDTHxHEIGHT[@LEFT,TOP][/TASKBAR][:DPI][*]`, several
// separated by commas: "1920x1080,1280x1024@1920,0". The task bar (40 pixels
// unless given) takes the bottom of the monitor; `*` marks the primary monitor,
// which otherwise is the first.
//
// Example:
//   RenderDesktopToFile("layout.dsk", ParseMonitorSet("2560x1440*,1920x1080@-1920,0"),
//                       "layout.png");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnForms.h"
#include "host/FormRender.h"

#include <iosfwd>
#include <vector>

namespace formkit {

/// A wrong command line of `formkit desktop`: the command answers with a usage error.
FK_EXCEPTION(EDesktopUsageError, Exception);

FK_RESOURCESTRING(sDesktopBadMonitors, "Cannot read the monitor set \"%s\": %s; write each monitor as "
                                       "WIDTHxHEIGHT[@LEFT,TOP][/TASKBAR][:DPI][*], separated by commas");
FK_RESOURCESTRING(sDesktopCannotRead, "Cannot read the desktop \"%s\": %s");
FK_RESOURCESTRING(sDesktopNotADesktop, "\"%s\" is no desktop file: %s");
FK_RESOURCESTRING(sDesktopUnknownAction, "Unknown action '%s' of 'formkit desktop'. Try 'formkit desktop --help'.");

/// The task bar a monitor has when the monitor set given names none, in pixels.
inline constexpr int DefaultTaskbarHeight = 40;

// The colours of the picture, plain 0x00BBGGRR values.
inline constexpr std::int32_t DesktopBackgroundColor = 0x202020;  ///< outside every monitor
inline constexpr std::int32_t DesktopTaskbarColor = 0x503C28;     ///< a monitor outside its work area
inline constexpr std::int32_t DesktopWorkAreaColor = 0x906A3A;    ///< a work area
inline constexpr std::int32_t DesktopOutlineColor = 0xF0F0F0;     ///< a monitor's outline
inline constexpr std::int32_t DesktopFrameColor = 0x5A5A5A;       ///< a window's frame
inline constexpr std::int32_t DesktopCaptionColor = 0xA05A1E;     ///< a window's caption bar
inline constexpr std::int32_t DesktopClientColor = 0xF0F0F0;      ///< a window's client area
inline constexpr std::int32_t DesktopDockCaptionColor = 0xC8B4A0; ///< a docked window's caption strip
inline constexpr std::int32_t DesktopSplitterColor = 0x8C8C8C;    ///< the space between docked windows
inline constexpr std::int32_t DesktopTabStripColor = 0xC8C8C8;    ///< a tab strip
inline constexpr std::int32_t DesktopTabColor = 0xDCDCDC;         ///< a tab
inline constexpr std::int32_t DesktopActiveTabColor = 0xFFFFFF;   ///< the selected tab

/// Reads a monitor set; raises `EDesktopUsageError` `sDesktopBadMonitors` with the
/// reason for a malformed one (no monitor, a size below 1, a task bar that leaves no
/// work area, a resolution below 1, two primaries).
[[nodiscard]] FK_API std::vector<TMonitorInfo> ParseMonitorSet(const String& Text);

/// Loads `DesktopFile` onto `Monitors` and draws it into `FileName`, a PNG or an SVG by
/// its extension, which is written beside itself first and moved into place. The
/// screen's monitors and the desktop's host variables are given back as they were, and
/// every window the load made is freed. Raises `ERenderError` `sDesktopCannotRead` for
/// a file that cannot be read, `sDesktopNotADesktop` for one that is no text or has no
/// section that describes a window (one with the key "Create"), and what the renderer
/// raises (`sRenderUnknownFormat`, `sRenderCannotWrite`, ...); then no file is written.
/// Cost: one load of the desktop and one image of the virtual screen's size.
FK_API void RenderDesktopToFile(const String& DesktopFile, const std::vector<TMonitorInfo>& Monitors,
                                const String& FileName);

/// `formkit desktop` with its arguments (`render FILE OUT [--monitors MONITORS]`). Raises
/// `EDesktopUsageError` for an unknown action or option or a missing value, and what
/// `RenderDesktopToFile` raises.
FK_API void RunDesktopCommand(const std::vector<String>& Args, std::ostream& Out);

/// The help text of `formkit desktop`.
#define DESKTOP_COMMAND_HELP                                                                                           \
  "Draws the layout a desktop file saves (windows with their captions, tab and join hosts with\n"                      \
  "their tabs, dock captions and splitters, minimised windows on the task bar) for a set of\n"                         \
  "monitors, into a PNG or an SVG file. The file is loaded as the environment loads it, so\n"                          \
  "every window lands where the environment would put it on those monitors.\n"                                         \
  "\n"                                                                                                                 \
  "  --monitors MONITORS   monitors as WIDTHxHEIGHT[@LEFT,TOP][/TASKBAR][:DPI][*], separated by\n"                         \
  "                    commas; TASKBAR is the height of the bar at the bottom (40), * marks the\n"                     \
  "                    primary monitor (else the first). Default: 1920x1080.\n"                                        \
  "                    Example: --monitors 1920x1080,1280x1024@1920,0/0\n"

} // namespace formkit
