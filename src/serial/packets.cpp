#include "serial/packets.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>

#include "platform/rounding.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

// Start byte, unit ID, code and end byte: a command with an empty body and no checksum.
constexpr std::size_t kFrameOverhead = 4;
// What the bytes of a checksummed body start their sum with.
constexpr std::uint8_t kChecksumSeed = 0xAA;
// Stands twice where the checksum would be 0.
constexpr std::uint8_t kZeroChecksumMark = 0x80;

Bytes WithCircuit(Bytes body, std::int16_t circuit) {
  const Bytes encoded = EncodeCircuit(circuit);
  body.insert(body.end(), encoded.begin(), encoded.end());
  return body;
}

}  // namespace

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

FadeRate EncodeFadeRate(std::uint8_t encoded_from, std::uint8_t encoded_to, std::uint8_t time) {
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

Bytes BuildPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body) {
  Bytes packet;
  packet.reserve(kFrameOverhead + body.size());
  for (const std::uint8_t byte : {kFrameByte, unit, code}) packet.push_back(byte);
  packet.insert(packet.end(), body.begin(), body.end());
  packet.push_back(kFrameByte);
  return packet;
}

Bytes BuildChecksummedPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body) {
  std::uint8_t sum = kChecksumSeed;
  for (const std::uint8_t byte : body) sum = static_cast<std::uint8_t>(sum + byte);

  Bytes checked(body.begin(), body.end());
  if (sum != 0) {
    checked.push_back(static_cast<std::uint8_t>(256 - sum));
  } else {
    checked.insert(checked.end(), 2, kZeroChecksumMark);
  }
  return BuildPacket(unit, code, checked);
}

Bytes SetIntensityPacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t percent) {
  return BuildPacket(unit, kCodeSetIntensity, WithCircuit({EncodeIntensity(percent)}, circuit));
}

Bytes DmxIntensityPacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t value) {
  return BuildPacket(unit, kCodeDmxIntensity, WithCircuit({value}, circuit));
}

Bytes FadePacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t time, std::uint8_t from_percent,
                 std::uint8_t to_percent) {
  const std::uint8_t from = EncodeIntensity(from_percent);
  const std::uint8_t to = EncodeIntensity(to_percent);
  const FadeRate rate = EncodeFadeRate(from, to, time);
  return BuildPacket(unit, kCodeFade, WithCircuit({from, to, rate.high, rate.low}, circuit));
}

Bytes EffectPacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t code) {
  return BuildPacket(unit, code, EncodeCircuit(circuit));
}

Bytes UnlockPacket(std::uint8_t unit) { return BuildChecksummedPacket(unit, kCodeUnlock, {}); }

Bytes SetAddressPacket(std::uint8_t unit, std::uint8_t new_id) {
  return BuildChecksummedPacket(unit, kCodeSetAddress, std::array{new_id, new_id, new_id});
}

Bytes HeartbeatPacket() { return BuildChecksummedPacket(kAllUnits, kCodeHeartbeat, {}); }

Bytes PollPacket(std::uint8_t unit, std::uint8_t kind, std::uint8_t pads) {
  return BuildPacket(unit, kCodePoll, std::array{kind, pads});
}

}  // namespace tendril
