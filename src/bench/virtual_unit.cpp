#include "bench/virtual_unit.h"

#include <algorithm>
#include <numeric>
#include <span>
#include <stdexcept>
#include <tuple>
#include <utility>

namespace tendril {
namespace {

constexpr std::uint8_t kAllUnits = 0xFF;
constexpr std::uint8_t kReplyAddress = 0xFE;

constexpr std::uint8_t kSetOption = 0x0A;
constexpr std::uint8_t kSetAddress = 0x0F;
constexpr std::uint8_t kPoll = 0x88;
constexpr std::uint8_t kUnlock = 0x8A;

constexpr std::uint8_t kServoOption = 17;
constexpr std::uint8_t kLivePosition = 137;
constexpr std::uint8_t kLiveEnd = 255;
constexpr std::size_t kMinOptionBody = 5;
constexpr std::size_t kPortOptionBody = 2 + std::tuple_size_v<PortOptionBytes>;  // option, port, bytes

constexpr std::uint8_t kAccepted = 10;
constexpr std::uint8_t kNothingNew = 1;

constexpr std::size_t kHeader = 2;  // unit, code
// The longest packet there is has 2 + 30 + 2 bytes; what is much longer is no packet but noise.
constexpr std::size_t kMaxPacket = 64;

bool SumsUp(std::span<const std::uint8_t> bytes) {
  return std::accumulate(bytes.begin(), bytes.end(), 0xAAu) % 256 == 0;
}

// The bodies that a packet's bytes after the code can stand for, none if the checksum is wrong. A body that
// ends in 80 with a checksum of 80 looks just like one without that 80 and with the pair: the caller decides by
// length.
std::vector<Bytes> PossibleBodies(std::span<const std::uint8_t> tail) {
  std::vector<Bytes> bodies;
  const std::size_t size = tail.size();
  if (size >= 2 && tail[size - 2] == 0x80 && tail[size - 1] == 0x80 && SumsUp(tail.first(size - 2))) {
    bodies.emplace_back(tail.begin(), tail.end() - 2);
  }
  if (size >= 1 && SumsUp(tail)) bodies.emplace_back(tail.begin(), tail.end() - 1);
  return bodies;
}

bool IsPort(std::uint8_t number) { return number >= 1 && number <= kUnitPorts; }

bool IsKnownBody(std::uint8_t code, const Bytes& body) {
  if (code == kSetAddress) return body.size() == 3 && body[0] == body[1] && body[1] == body[2];
  if (body.size() < kMinOptionBody) return false;
  if (body[0] != kServoOption) return true;
  if (body[1] == kLivePosition) return body.size() == kMinOptionBody && body[4] == kLiveEnd;
  return IsPort(body[1]) && body.size() == kPortOptionBody;
}

std::size_t SlotOf(int port) {
  if (port < 1 || port > kUnitPorts) throw std::out_of_range("a unit has ports 1 to 8");
  return static_cast<std::size_t>(port - 1);
}

}  // namespace

VirtualUnit::VirtualUnit(std::uint8_t id, const ReplyTiming& timing) : id_(id), timing_(timing) {
  ports_.fill(kFreshPortOptions);
}

const PortOptionBytes& VirtualUnit::PortOptions(int port) const { return ports_[SlotOf(port)]; }

void VirtualUnit::SetPortOptions(int port, const PortOptionBytes& options) { ports_[SlotOf(port)] = options; }

std::optional<std::uint8_t> VirtualUnit::LivePosition(int port) const {
  return live_positions_[SlotOf(port)];
}

std::vector<Transmission> VirtualUnit::Hear(std::uint8_t byte, std::uint64_t at_us) {
  if (byte != 0) {
    if (seen_zero_ && packet_.size() <= kMaxPacket) packet_.push_back(byte);
    return {};
  }
  seen_zero_ = true;
  const Bytes packet = std::exchange(packet_, {});
  if (packet.size() < kHeader || packet.size() > kMaxPacket) return {};
  if (packet[0] != id_ && packet[0] != kAllUnits) return {};
  if (!Attends(packet[1], at_us)) return {};
  return HandlePacket(packet, at_us);
}

std::vector<Transmission> VirtualUnit::HandlePacket(const Bytes& packet, std::uint64_t at_us) {
  const std::uint8_t code = packet[1];
  const bool unlocked = std::exchange(unlocked_, false);
  if (code == kUnlock) {
    unlocked_ = packet.size() == kHeader + 1 && SumsUp(std::span(packet).subspan(kHeader));
    if (!unlocked_) ++rejected_commands_;
  } else if (code == kSetOption || code == kSetAddress) {
    HandleConfiguration(packet, unlocked, at_us);
  } else if (code == kPoll && packet.size() == kHeader + 2) {
    ++polls_heard_;
    const std::uint8_t kind = packet[2];
    if (const std::optional<Bytes> data = ReplyData(kind)) return {Reply(kind, *data, at_us)};
  }
  return {};
}

void VirtualUnit::HandleConfiguration(const Bytes& packet, bool unlocked, std::uint64_t at_us) {
  const std::uint8_t code = packet[1];
  const std::vector<Bytes> bodies = PossibleBodies(std::span(packet).subspan(kHeader));
  const auto known =
      std::find_if(bodies.begin(), bodies.end(), [&](const Bytes& body) { return IsKnownBody(code, body); });
  if (!unlocked || known == bodies.end()) {
    ++rejected_commands_;
    return;
  }
  ++accepted_commands_;
  acknowledge_ = true;
  Apply(code, *known, at_us);
}

void VirtualUnit::Apply(std::uint8_t code, const Bytes& body, std::uint64_t at_us) {
  if (code == kSetAddress) return TakeAddress(body[0], at_us);
  if (body[0] != kServoOption) return;  // accepted; what it does is not seen on the line
  if (body[1] == kLivePosition) {
    for (int port = 1; port <= kUnitPorts; ++port) {
      if ((body[2] >> (port - 1) & 1) != 0) live_positions_[SlotOf(port)] = body[3];
    }
  } else {
    std::copy(body.begin() + 2, body.end(), ports_[SlotOf(body[1])].begin());
  }
}

bool VirtualUnit::Attends(std::uint8_t /*code*/, std::uint64_t /*at_us*/) { return true; }

std::optional<Bytes> VirtualUnit::ReplyData(std::uint8_t kind) {
  if (kind == '0') return Bytes{1, std::exchange(acknowledge_, false) ? kAccepted : kNothingNew};
  if (kind == '*' || kind == '+') return Bytes{id_};
  if (kind != 'n') return std::nullopt;
  const std::uint8_t port = NextReportedPort();
  Bytes data = {port};
  const PortOptionBytes& options = IsPort(port) ? PortOptions(port) : kFreshPortOptions;
  data.insert(data.end(), options.begin(), options.end());
  return data;
}

Transmission VirtualUnit::Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) {
  Transmission reply{.start_us = poll_end_us + timing_.turn_round_us, .bytes = Bytes(timing_.pads, 0)};
  reply.bytes.insert(reply.bytes.end(), {kReplyAddress, kind});
  reply.bytes.insert(reply.bytes.end(), data.begin(), data.end());
  reply.bytes.push_back(0);
  return reply;
}

std::uint8_t VirtualUnit::NextReportedPort() {
  const std::uint8_t port = next_port_;
  next_port_ = static_cast<std::uint8_t>(port % kUnitPorts + 1);
  return port;
}

void VirtualUnit::TakeAddress(std::uint8_t id, std::uint64_t /*at_us*/) { id_ = id; }

}  // namespace tendril
