//===- core/root/RootClassGroup.cpp - The class group chosen for a module ===//
#include "core/root/ComponentRoot.h"

#include "platform/Rtti.h"

namespace formkit {

TClass TComponentRoot::GetClassGroupClass() {
  if (FClassGroupName.empty()) return nullptr;
  PTypeInfo Type = TRttiContext().FindType(FClassGroupName);
  TClass Class = Type && Type->Kind == tkClass ? GetTypeData(Type)->ClassRef : nullptr;
  return Class && Class->InheritsFrom(TPersistent::StaticClass()) ? Class : nullptr;
}

void TComponentRoot::SetClassGroupName(const String& Name) { FClassGroupName = Name; }

} // namespace formkit
