//===- tests/frameworks/kiln/design/StringsHost.cpp - A host with a code editor ===//
#include "tests/frameworks/kiln/design/StringsHost.h"

namespace formkit::fakes {

FK_IMPLEMENT(TStringsHostEditor, "StringsHost") {}
FK_IMPLEMENT(TStringsHostModule, "StringsHost") {}
FK_IMPLEMENT(TStringsHostServices, "StringsHost") {}

} // namespace formkit::fakes
