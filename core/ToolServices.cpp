//===- core/ToolServices.cpp - The global service object -----------------===//
#include "core/ToolServices.h"

namespace formkit {

IPtr<IHalvernIDEServices> HalvernIDEServices;

} // namespace formkit
