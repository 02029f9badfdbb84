//===- core/DesignerTypes.h - Window states of designers -----------------===//
//
// The show state of a designer's window and the set of its state flags.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/TypInfo.h"

namespace formkit {

FK_ENUM(TShowState, std::uint8_t, ssNormal, ssMinimized, ssMaximized)
FK_ENUM(TDesignerStateItem, std::uint8_t, dsVisible, dsIconic, dsZoomed)
FK_SET(TDesignerState, TDesignerStateItem)

} // namespace formkit
