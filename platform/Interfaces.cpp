//===- platform/Interfaces.cpp - Interface identities ---------------------===//
#include "platform/Interfaces.h"

#include <cstdio>

namespace formkit {

FK_RESOURCESTRING(SInvalidGUID, "'%s' is not a valid GUID value");

TGUID TGUID::FromString(std::string_view Text) {
  auto IsHex = [](char C) { return (C >= '0' && C <= '9') || (C >= 'a' && C <= 'f') || (C >= 'A' && C <= 'F'); };
  bool Ok = Text.size() == 38;
  for (size_t I = 0; Ok && I < Text.size(); ++I) {
    char C = Text[I];
    if (I == 0) Ok = C == '{';
    else if (I == 37) Ok = C == '}';
    else if (I == 9 || I == 14 || I == 19 || I == 24) Ok = C == '-';
    else Ok = IsHex(C);
  }
  if (!Ok) throw EConvertError(SInvalidGUID, String(Text));
  return ParseChecked(String(Text).c_str());
}

namespace detail {
void RaiseIntfCastError() { throw EIntfCastError(SInterfaceNotSupported); }
} // namespace detail

String TGUID::ToString() const {
  char Buf[40];
  std::snprintf(Buf, sizeof Buf, "{%08X-%04X-%04X-%02X%02X-%02X%02X%02X%02X%02X%02X}", D1, D2, D3, D4[0], D4[1],
                D4[2], D4[3], D4[4], D4[5], D4[6], D4[7]);
  return Buf;
}

} // namespace formkit
