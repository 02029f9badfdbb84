//===- tests/tree/TreeFixture.cpp - The host view's stand-ins ------------===//
#include "tests/tree/TreeFixture.h"

#include "platform/TypInfoBuilder.h"

namespace formkit::fakes {

FK_IMPLEMENT(TViewNode, "TreeFixture") {}
FK_IMPLEMENT(TViewContext, "TreeFixture") {}
FK_IMPLEMENT(TStructureViewBase, "TreeFixture") {}
FK_IMPLEMENT(TStructureViewHost, "TreeFixture") {}
FK_IMPLEMENT(TBridgeView, "TreeFixture") {}

} // namespace formkit::fakes
