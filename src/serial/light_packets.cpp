#include "serial/light_packets.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

#include "platform/rounding.h"
#include "platform/runtime_error.h"
#include "serial/packets.h"

namespace tendril {

Bytes EncodeCircuit(std::int16_t circuit) {
  if (circuit < 0) throw RuntimeError(kErrOverflow, "Overflow");
  if (circuit < kFirstTwoByteCircuit) return {static_cast<std::uint8_t>(0x80 | circuit)};
  const int clamped = std::min(circuit, kLastCircuit);
  return {static_cast<std::uint8_t>(0xC0 | clamped % 64), static_cast<std::uint8_t>(0x80 | clamped / 64)};
}

std::uint8_t EncodeIntensity(std::uint8_t percent) {
  if (percent == 0xFF) return 0xFF;
  if (percent == 0) return 0xF0;
  if (percent >= 100) return 0x01;
  return static_cast<std::uint8_t>(228 - 2 * percent);
}

std::array<std::uint8_t, 2> EncodeFadeRate(std::uint8_t encoded_from, std::uint8_t encoded_to,
                                           std::uint8_t time) {
  if (time == 0) throw RuntimeError(kErrDivisionByZero, "Division by zero");
  // At most 254 * 256 / 12: it fits 16 bits with a sign.
  const int rate = RoundHalfToEven(std::abs(encoded_from - encoded_to) * 256.0 / (time * 12.0));
  int low = rate % 256;
  int high = rate / 256;
  // Bits that no rate uses mark the bytes that are zero.
  if (high == 0) high |= 0x80;
  if (low == 0) {
    high |= 0x40;
    low = 1;
  }
  return {static_cast<std::uint8_t>(high), static_cast<std::uint8_t>(low)};
}

Bytes LightPacket(std::uint8_t unit, std::uint8_t code, Bytes body, std::int16_t circuit) {
  const Bytes encoded = EncodeCircuit(circuit);
  body.insert(body.end(), encoded.begin(), encoded.end());
  return BuildPacket(unit, code, body);
}

}  // namespace tendril
