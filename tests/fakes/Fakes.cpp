//===- tests/fakes/Fakes.cpp - Class records of the fakes ----------------===//
#include "tests/fakes/FakeDesigner.h"
#include "tests/fakes/RecordingEnvironment.h"
#include "tests/fakes/RecordingModule.h"

namespace formkit::fakes {

FK_IMPLEMENT(TRecordingEnvironment, "Fakes") {}
FK_IMPLEMENT(TRecordingModule, "Fakes") {}
FK_IMPLEMENT(TViewRecordingModule, "Fakes") {}
FK_IMPLEMENT(TFakeRoot, "Fakes") {}
FK_IMPLEMENT(TFakeDesigner, "Fakes") {}

} // namespace formkit::fakes

#include "tests/fakes/RecordingServices.h"

namespace formkit::fakes {
FK_IMPLEMENT(TRecordingPalette, "Fakes") {}
FK_IMPLEMENT(TServicesBase, "Fakes") {}
FK_IMPLEMENT(TRecordingServices, "Fakes") {}
} // namespace formkit::fakes
