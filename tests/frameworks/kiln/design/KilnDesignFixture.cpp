//===- tests/frameworks/kiln/design/KilnDesignFixture.cpp - Class records of the fixture ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

namespace formkit::fakes {
FK_IMPLEMENT(TToolItem, "Tests") {}
} // namespace formkit::fakes
