#include "serial/packets.h"

#include <array>

namespace tendril {
namespace {

// What the bytes of a checksummed body start their sum with.
constexpr std::uint8_t kChecksumSeed = 0xAA;
// Stands twice where the checksum would be 0.
constexpr std::uint8_t kZeroChecksumMark = 0x80;

}  // namespace

Bytes BuildPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body) {
  Bytes packet{kFrameByte, unit, code};
  packet.reserve(packet.size() + body.size() + 1);
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

Bytes UnlockPacket(std::uint8_t unit) { return BuildChecksummedPacket(unit, kCodeUnlock, {}); }

Bytes SetAddressPacket(std::uint8_t unit, std::uint8_t new_id) {
  return BuildChecksummedPacket(unit, kCodeSetAddress, std::array{new_id, new_id, new_id});
}

Bytes HeartbeatPacket() { return BuildChecksummedPacket(kAllUnits, kCodeHeartbeat, {}); }

Bytes PollPacket(std::uint8_t unit, std::uint8_t kind, std::uint8_t pads) {
  return BuildPacket(unit, kCodePoll, std::array{kind, pads});
}

}  // namespace tendril
