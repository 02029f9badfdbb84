//===- tests/desktop/DesktopTestWindows.cpp - Test window classes --------===//
#include "tests/desktop/DesktopTestWindows.h"

namespace formkit::desktoptest {
FK_IMPLEMENT(TPaneWindow, "DesktopTest") {}
FK_IMPLEMENT(TSectionAwareWindow, "DesktopTest") {}
FK_IMPLEMENT(TSectionListManager, "DesktopTest") {}
FK_IMPLEMENT(THostWindow, "DesktopTest") {}
FK_IMPLEMENT(TBrokenWindow, "DesktopTest") {}
} // namespace formkit::desktoptest
