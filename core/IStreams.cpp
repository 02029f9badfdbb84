//===- core/IStreams.cpp - Host streams over the library's streams -------===//
#include "core/IStreams.h"

#include "platform/TypInfoBuilder.h"

namespace formkit {

FK_IMPLEMENT(TIMemoryStream, "IStreams") {}
FK_IMPLEMENT(TVirtualStream, "IStreams") {}

} // namespace formkit
