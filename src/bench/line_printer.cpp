#include "bench/line_printer.h"

#include <algorithm>
#include <cstdio>
#include <span>
#include <string_view>
#include <utility>

#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::size_t kShownBytes = 40;      // more than any packet has; noise can be much longer
constexpr std::size_t kShownZeros = 4;       // in a row at the beginning
constexpr std::uint64_t kSilenceUs = 2'000;  // zero bytes this far apart do not belong together
constexpr std::size_t kHexWidth = 47;        // of a packet of 16 bytes, as those with a port's options are

// Many zero bytes at the beginning, the pads of a patient unit, are given as a count.
std::string HexList(const Bytes& bytes) {
  const auto begin = std::find_if(bytes.begin(), bytes.end(), [](std::uint8_t byte) { return byte != 0; });
  const auto zeros = static_cast<std::size_t>(begin - bytes.begin());
  std::span<const std::uint8_t> rest = bytes;
  std::string text;
  if (zeros > kShownZeros) {
    rest = rest.subspan(zeros);
    text = std::to_string(zeros) + " x 00" + (rest.empty() ? "" : " ");
  }
  text += HexBytes(rest.first(std::min(rest.size(), kShownBytes)));
  if (rest.size() > kShownBytes) text += " ... (" + std::to_string(bytes.size()) + " bytes)";
  return text;
}

std::string Kind(std::uint8_t kind) {
  if (kind > ' ' && kind < 0x7F) return std::string("'") + static_cast<char>(kind) + "'";
  return std::to_string(kind);
}

std::string Unit(std::uint8_t id) { return id == 0xFF ? "all units" : "unit " + HexByte(id); }

std::string DescribeOption(const Bytes& packet, const std::string& unit) {
  if (packet.size() < 6) return "set option of " + unit + ", too short";
  const std::uint8_t option = packet[2];
  const std::uint8_t selector = packet[3];
  if (option == 17 && selector == 137) {
    return "live position of " + unit + ": ports mask " + HexByte(packet[4]) + ", " +
           std::to_string(packet[5] * 10) + " us";
  }
  if (option == 17) return "set options of port " + std::to_string(selector) + " of " + unit;
  return "set option " + std::to_string(option) + " of " + unit;
}

std::string DescribeCommand(const Bytes& packet) {
  if (packet.size() < 2) return "no packet";
  const std::string unit = Unit(packet[0]);
  switch (packet[1]) {
    case 0x03:
    case 0x08:
      return "set intensity of " + unit;
    case 0x04:
      return "fade on " + unit;
    case 0x06:
      return "twinkle on " + unit;
    case 0x07:
      return "shimmer on " + unit;
    case 0x0A:
      return DescribeOption(packet, unit);
    case 0x0F:
      return packet.size() > 2 ? "set ID of " + unit + " to " + HexByte(packet[2])
                               : "set ID of " + unit + ", too short";
    case 0x81:
      return "heartbeat to " + unit;
    case 0x88:
      return packet.size() > 2 ? "poll " + unit + ", kind " + Kind(packet[2])
                               : "poll " + unit + ", too short";
    case 0x8A:
      return "unlock " + unit;
    default:
      return "command " + HexByte(packet[1]) + " to " + unit;
  }
}

std::string DescribeReply(const Bytes& packet) {
  if (packet.size() < 2 || packet[0] != 0xFE) return "noise";
  const std::uint8_t kind = packet[1];
  const Bytes data(packet.begin() + 2, packet.end());
  const std::string reply = "reply to " + Kind(kind) + ": ";
  if (kind == '0' && data.size() >= 2) return reply + (data[1] == 10 ? "acknowledged" : "nothing accepted");
  if (kind == 'n' && data.size() >= 10) return reply + "options of port " + std::to_string(data[0]);
  if ((kind == '*' || kind == '+') && !data.empty()) return reply + "here is unit " + HexByte(data[0]);
  return reply + std::to_string(data.size()) + " data bytes";
}

// What a packet means, given with or without its zero bytes: "set options of port 3 of unit 01".
std::string DescribePacket(LineSide from, const Bytes& bytes) {
  const auto is_zero = [](std::uint8_t byte) { return byte == 0; };
  const auto begin = std::find_if_not(bytes.begin(), bytes.end(), is_zero);
  if (begin == bytes.end()) {
    return bytes.size() == 1 ? "1 zero byte" : std::to_string(bytes.size()) + " zero bytes";
  }
  const Bytes packet(begin, std::find_if(begin, bytes.end(), is_zero));
  return from == LineSide::kProgram ? DescribeCommand(packet) : DescribeReply(packet);
}

}  // namespace

LinePrinter::LinePrinter(std::function<void(const std::string&)> print) : print_(std::move(print)) {}

void LinePrinter::Note(const LineByte& byte) {
  const bool apart = !has_content_ && byte.at_us - last_us_ > kSilenceUs;
  if (byte.from != from_ || apart) Flush();
  from_ = byte.from;
  last_us_ = byte.at_us;
  garbled_ = garbled_ || byte.garbled;
  bytes_.push_back(byte.value);
  if (byte.value != 0) {
    has_content_ = true;
  } else if (has_content_) {
    Flush();
  }
}

void LinePrinter::Flush() {
  const Bytes bytes = std::exchange(bytes_, {});
  const bool garbled = std::exchange(garbled_, false);
  has_content_ = false;
  if (bytes.empty()) return;
  char time_and_side[32];
  std::snprintf(time_and_side, sizeof time_and_side, "%12.6f  %-9s", static_cast<double>(last_us_) / 1e6,
                from_ == LineSide::kProgram ? "program" : "unit");
  std::string hex = HexList(bytes);
  hex.resize(std::max(hex.size(), kHexWidth), ' ');
  print_(time_and_side + hex + "  " + DescribePacket(from_, bytes) + (garbled ? " (garbled)" : ""));
}

}  // namespace tendril
