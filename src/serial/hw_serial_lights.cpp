// HwSerial's light commands.
#include <utility>

#include "platform/runtime_error.h"
#include "serial/hw_serial.h"
#include "serial/light_packets.h"

namespace tendril {
namespace {

[[noreturn]] void RejectUnsupported(const char* what) {
  throw RuntimeError(kErrUnsupported, std::string(what) + " is not supported");
}

bool TakesTwoBytes(std::int16_t circuit) { return circuit >= kFirstTwoByteCircuit; }

}  // namespace

void HwSerial::SendLight(std::string_view trace, std::uint8_t unit, std::int16_t circuit, std::uint8_t code,
                         Bytes body, std::uint8_t intensity) {
  Traced(trace, [&] {
    OpenPort();
    SendCommand(unit, circuit, code, intensity, LightPacket(unit, code, std::move(body), circuit),
                TakesTwoBytes(circuit));
  });
}

void HwSerial::cmdSetIntensity(std::uint8_t unit, std::int16_t circuit, std::uint8_t intensity) {
  SendLight("Trace: SetIntensity", unit, circuit, kCodeSetIntensity, {EncodeIntensity(intensity)}, intensity);
}

void HwSerial::CmdSetDMXIntensity(std::uint8_t unit, std::int16_t circuit, std::uint8_t value) {
  if (value != 0) return SendLight("Trace: SetIntensity", unit, circuit, kCodeDmxIntensity, {value});
  Traced("Trace: SetIntensity", [&] {
    OpenPort();
    cmdSetIntensity(unit, circuit, 0);  // a zero byte would end the packet
  });
}

void HwSerial::cmdFade(std::uint8_t unit, std::int16_t circuit, std::uint8_t time, std::uint8_t from,
                       std::uint8_t to) {
  Traced("Trace: Fade", [&] {
    OpenPort();
    const std::uint8_t first = EncodeIntensity(from);
    const std::uint8_t last = EncodeIntensity(to);
    const auto [high, low] = EncodeFadeRate(first, last, time);
    SendCommand(unit, circuit, kCodeFade, kNoIntensity,
                LightPacket(unit, kCodeFade, {first, last, high, low}, circuit), TakesTwoBytes(circuit));
  });
}

void HwSerial::cmdSetTwinkle(std::uint8_t unit, std::int16_t circuit) {
  SendLight("Trace: SetTwinkle", unit, circuit, kCodeTwinkle, {});
}

void HwSerial::cmdSetShimmer(std::uint8_t unit, std::int16_t circuit) {
  SendLight("Trace: SetShimmer", unit, circuit, kCodeShimmer, {});
}

void HwSerial::cmdSetTwinkleSpecial(std::uint8_t /*unit*/, std::int16_t /*circuit*/, std::uint8_t /*a*/,
                                    std::uint8_t /*b*/, std::uint8_t /*c*/) {
  Traced("Trace: SetTwinkleSpecial", [] { RejectUnsupported("The special twinkle command"); });
}

void HwSerial::cmdSetShimmerSpecial(std::uint8_t /*unit*/, std::int16_t /*circuit*/, std::uint8_t /*a*/,
                                    std::uint8_t /*b*/, std::uint8_t /*c*/) {
  Traced("Trace: SetShimmerSpecial", [] { RejectUnsupported("The special shimmer command"); });
}

void HwSerial::FlushCB() { RejectUnsupported("Flushing the command buffer"); }

}  // namespace tendril
