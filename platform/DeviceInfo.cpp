//===- platform/DeviceInfo.cpp - The devices a form can be designed for --===//
#include "platform/DeviceInfo.h"

#include <algorithm>

namespace formkit {

namespace {

std::vector<std::unique_ptr<TDeviceInfo>>& DeviceList() {
  static std::vector<std::unique_ptr<TDeviceInfo>> List;
  return List;
}

auto FindDevice(const String& ID) {
  auto& List = DeviceList();
  return std::find_if(List.begin(), List.end(), [&](const auto& Device) { return SameText(Device->ID(), ID); });
}

} // namespace

bool TDeviceInfo::HasAttribute(const String& Name) const {
  return std::any_of(FAttributes.begin(), FAttributes.end(), [&](const auto& A) { return SameText(A.first, Name); });
}

String TDeviceInfo::GetAttribute(const String& Name) const {
  for (const auto& [Key, Value] : FAttributes)
    if (SameText(Key, Name)) return Value;
  return String();
}

TDeviceInfo* TDeviceInfo::GetDeviceByID(const String& ID) {
  auto It = FindDevice(ID);
  return It == DeviceList().end() ? nullptr : It->get();
}

TDeviceInfo* TDeviceInfo::AddDevice(const String& ID, TAttributes Attributes) {
  if (TDeviceInfo* Known = GetDeviceByID(ID)) {
    Known->FAttributes = std::move(Attributes);
    return Known;
  }
  DeviceList().push_back(std::make_unique<TDeviceInfo>(ID, std::move(Attributes)));
  return DeviceList().back().get();
}

void TDeviceInfo::RemoveDevice(const String& ID) {
  if (auto It = FindDevice(ID); It != DeviceList().end()) DeviceList().erase(It);
}

void TDeviceInfo::ClearDevices() { DeviceList().clear(); }

std::vector<TDeviceInfo*> TDeviceInfo::Devices() {
  std::vector<TDeviceInfo*> All;
  for (const auto& Device : DeviceList()) All.push_back(Device.get());
  return All;
}

} // namespace formkit
