//===- platform/ComponentStreaming.cpp - How a component streams itself ---===//
//
// A component reads and writes itself through the filer; overrides of
// `ReadState` and `WriteState` add what a class needs around that. Every
// component also streams its design position, which a non-visual component has
// no published property for, as the defined properties "Left" and "Top".
//
// Example (text form of a non-visual component placed at 40, 16):
//   object Timer1: TTimer
//     Left = 40
//     Top = 16
//   end
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"

namespace formkit {

void TComponent::ReadState(TReader* Reader) { Reader->ReadData(this); }

void TComponent::WriteState(TWriter* Writer) { Writer->WriteData(this); }

namespace {
std::int16_t LeftOf(std::int32_t Info) { return static_cast<std::int16_t>(Info & 0xFFFF); }
std::int16_t TopOf(std::int32_t Info) { return static_cast<std::int16_t>((Info >> 16) & 0xFFFF); }
std::int16_t ReadCoordinate(TReader* R) {
  std::int32_t V = R->ReadInteger();
  if (V < INT16_MIN || V > INT16_MAX) throw EReadError("Invalid property value");
  return static_cast<std::int16_t>(V);
}
std::int32_t Pack(std::int16_t Left, std::int16_t Top) {
  return static_cast<std::int32_t>((static_cast<std::uint32_t>(static_cast<std::uint16_t>(Top)) << 16) |
                                   static_cast<std::uint16_t>(Left));
}
} // namespace

void TComponent::DefineProperties(TFiler* Filer) {
  inherited::DefineProperties(Filer);
  // Compared with the ancestor's position, so an inherited component that was not
  // moved writes nothing.
  auto* Ancestor = dynamic_cast<TComponent*>(Filer->Ancestor());
  std::int32_t Base = Ancestor ? Ancestor->DesignInfo() : 0;
  std::int32_t Info = DesignInfo();
  Filer->DefineProperty(
      "Left",
      [this](TReader* R) {
        std::int16_t V = ReadCoordinate(R);
        SetDesignInfo(Pack(V, TopOf(DesignInfo())));
      },
      [this](TWriter* W) { W->WriteInteger(LeftOf(DesignInfo())); }, LeftOf(Info) != LeftOf(Base));
  Filer->DefineProperty(
      "Top",
      [this](TReader* R) {
        std::int16_t V = ReadCoordinate(R);
        SetDesignInfo(Pack(LeftOf(DesignInfo()), V));
      },
      [this](TWriter* W) { W->WriteInteger(TopOf(DesignInfo())); }, TopOf(Info) != TopOf(Base));
}

} // namespace formkit
