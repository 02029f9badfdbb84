//===- platform/DeviceInfo.h - The devices a form can be designed for ----===//
//
// A device is an identifier ("Phone", "Tablet") with named attributes (a
// screen size, a form factor). The run time keeps one list of them, which the
// host fills as it starts; designers read it to name the views of a module
// and to offer the devices a module has no view for yet. Identifiers and
// attribute names compare without regard to case.
//
// Example:
//   TDeviceInfo::AddDevice("Phone", {{"Size", "360x640"}});
//   if (TDeviceInfo* Phone = TDeviceInfo::GetDeviceByID("phone"))
//     String Size = Phone->GetAttribute("Size");   // "360x640"
//   TDeviceInfo::ClearDevices();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <memory>
#include <utility>
#include <vector>

namespace formkit {

/// One device: its identifier and attributes. The list of devices owns each one.
class FK_API TDeviceInfo {
public:
  using TAttributes = std::vector<std::pair<String, String>>;

  TDeviceInfo(String ID, TAttributes Attributes) : FID(std::move(ID)), FAttributes(std::move(Attributes)) {}

  const String& ID() const noexcept { return FID; }
  /// Whether the device has the attribute `Name`.
  [[nodiscard]] bool HasAttribute(const String& Name) const;
  /// The value of attribute `Name`; empty when the device has none.
  [[nodiscard]] String GetAttribute(const String& Name) const;
  const TAttributes& Attributes() const noexcept { return FAttributes; }

  // The run time's list --------------------------------------------------------------
  /// The device with identifier `ID`, or null. The device stays the list's.
  [[nodiscard]] static TDeviceInfo* GetDeviceByID(const String& ID);
  /// Adds a device, or replaces the attributes of the one with that identifier.
  static TDeviceInfo* AddDevice(const String& ID, TAttributes Attributes);
  /// Removes the device `ID`; nothing when there is none. Pointers to it dangle after.
  static void RemoveDevice(const String& ID);
  /// Empties the list.
  static void ClearDevices();
  /// The devices in the order they were added; they stay the list's.
  [[nodiscard]] static std::vector<TDeviceInfo*> Devices();

private:
  String FID;
  TAttributes FAttributes;
};

} // namespace formkit
