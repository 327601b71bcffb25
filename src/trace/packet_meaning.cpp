#include "trace/packet_meaning.h"

#include <algorithm>
#include <bit>

#include "config/option_bytes.h"
#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr std::size_t kShownZeros = 4;  // in a row at the beginning

std::string PollKind(std::uint8_t kind) {
  if (kind > ' ' && kind < 0x7F) return std::string("'") + static_cast<char>(kind) + "'";
  return std::to_string(kind);
}

std::string UnitInWords(std::uint8_t id) { return id == kAllUnits ? "all units" : "unit " + HexByte(id); }

// "port 3", "ports 1 2 8".
std::string PortsInWords(std::uint8_t mask) {
  std::string ports;
  for (int port = 1; port <= 8; ++port) {
    if ((mask >> (port - 1)) % 2 != 0) ports += " " + std::to_string(port);
  }
  return (std::has_single_bit(mask) ? "port" : "ports") + (ports.empty() ? " none" : ports);
}

std::string DescribeOption(std::span<const std::uint8_t> packet, const std::string& unit) {
  if (packet.size() < 6) return "set option of " + unit + ", too short";
  const std::uint8_t option = packet[2];
  const std::uint8_t selector = packet[3];
  if (option == kOptionServoPort && selector == kLivePosition) {
    return "live position of " + unit + ": " + PortsInWords(packet[4]) + ", " +
           std::to_string(packet[5] * kPulseResolution) + " µs";
  }
  if (option == kOptionServoPort) return "set options of port " + std::to_string(selector) + " of " + unit;
  return "set option " + std::to_string(option) + " of " + unit;
}

std::string DescribeCommand(std::span<const std::uint8_t> packet) {
  if (packet.size() < 2) return "no packet";
  const std::string unit = UnitInWords(packet[0]);
  switch (packet[1]) {
    case kCodeSetOption:
      return DescribeOption(packet, unit);
    case kCodeSetAddress:
      return packet.size() > 2 ? "set ID of " + unit + " to " + HexByte(packet[2])
                               : "set ID of " + unit + ", too short";
    case kCodeHeartbeat:
      return "heartbeat to " + unit;
    case kCodePoll:
      return packet.size() > 2 ? "poll " + unit + ", kind " + PollKind(packet[2])
                               : "poll " + unit + ", too short";
    case kCodeUnlock:
      return "unlock " + unit;
    default:
      return "command " + HexByte(packet[1]) + " to " + unit;
  }
}

std::string DescribeReply(std::span<const std::uint8_t> packet) {
  if (!IsReply(packet)) return "noise";
  const std::uint8_t kind = packet[1];
  const auto data = packet.subspan(2);
  const std::string reply = "reply to " + PollKind(kind) + ": ";
  if (kind == '0' && data.size() >= 2)
    return reply + (data[1] == kReplyAccepted ? "acknowledged" : "nothing accepted");
  if (kind == 'n' && data.size() >= 10) return reply + "options of port " + std::to_string(data[0]);
  if ((kind == '*' || kind == '+') && !data.empty()) return reply + "here is unit " + HexByte(data[0]);
  return reply + std::to_string(data.size()) + (data.size() == 1 ? " data byte" : " data bytes");
}

template <typename Describe>
std::string DescribePacket(std::span<const std::uint8_t> bytes, Describe describe) {
  const auto rest = bytes.subspan(LeadingZeros(bytes));
  if (rest.empty()) return bytes.size() == 1 ? "1 zero byte" : std::to_string(bytes.size()) + " zero bytes";
  const auto end = std::find(rest.begin(), rest.end(), kFrameByte);
  return describe(rest.first(static_cast<std::size_t>(end - rest.begin())));
}

}  // namespace

std::string DescribeSent(std::span<const std::uint8_t> bytes) {
  return DescribePacket(bytes, DescribeCommand);
}

std::string DescribeReceived(std::span<const std::uint8_t> bytes) {
  return DescribePacket(bytes, DescribeReply);
}

bool IsReply(std::span<const std::uint8_t> bytes) {
  const auto packet = bytes.subspan(LeadingZeros(bytes));
  return packet.size() > 1 && packet[0] == kProgramAddress && packet[1] != kFrameByte;
}

std::size_t LeadingZeros(std::span<const std::uint8_t> bytes) {
  const auto begin = std::find_if(bytes.begin(), bytes.end(), [](std::uint8_t byte) { return byte != 0; });
  return static_cast<std::size_t>(begin - bytes.begin());
}

std::string ShownBytes(std::span<const std::uint8_t> bytes, std::size_t shown, std::size_t all) {
  const std::size_t zeros = LeadingZeros(bytes);
  std::size_t size = all;
  std::string text;
  if (zeros > kShownZeros) {
    bytes = bytes.subspan(zeros);
    size -= zeros;
    text = std::to_string(zeros) + " x 00" + (bytes.empty() ? "" : " ");
  }
  text += HexBytes(bytes.first(std::min(bytes.size(), shown)));
  if (size > shown) text += " ... (" + std::to_string(all) + " bytes)";
  return text;
}

}  // namespace tendril
