#include "bench/printers.h"

#include <algorithm>
#include <cstdio>
#include <optional>
#include <span>
#include <string_view>
#include <utility>

#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::size_t kShownOfPacket = 40;   // more than any packet has; noise can be much longer
constexpr std::size_t kShownOfFrame = 24;    // more than any frame but those with a text or lighting data
constexpr std::size_t kShownZeros = 4;       // in a row at the beginning
constexpr std::uint64_t kSilenceUs = 2'000;  // zero bytes this far apart do not belong together
constexpr std::size_t kHexWidth = 47;        // of a packet of 16 bytes, as those with a port's options are

// At most `shown` bytes. Many zero bytes at the beginning, the pads of a patient unit, are given as a count.
std::string HexList(std::span<const std::uint8_t> bytes, std::size_t shown) {
  const auto begin = std::find_if(bytes.begin(), bytes.end(), [](std::uint8_t byte) { return byte != 0; });
  const auto zeros = static_cast<std::size_t>(begin - bytes.begin());
  std::span<const std::uint8_t> rest = bytes;
  std::string text;
  if (zeros > kShownZeros) {
    rest = rest.subspan(zeros);
    text = std::to_string(zeros) + " x 00" + (rest.empty() ? "" : " ");
  }
  text += HexBytes(rest.first(std::min(rest.size(), shown)));
  if (rest.size() > shown) text += " ... (" + std::to_string(bytes.size()) + " bytes)";
  return text;
}

std::string Columns(std::uint64_t at_us, const char* from, std::string hex, const std::string& meaning) {
  char time_and_side[32];
  std::snprintf(time_and_side, sizeof time_and_side, "%12.6f  %-9s", static_cast<double>(at_us) / 1e6, from);
  hex.resize(std::max(hex.size(), kHexWidth), ' ');
  return time_and_side + hex + "  " + meaning;
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

std::string Printable(std::span<const std::uint8_t> text) {
  std::string printable;
  for (const std::uint8_t byte : text.first(std::min(text.size(), kShownOfFrame))) {
    printable += byte >= ' ' && byte < 0x7F ? static_cast<char>(byte) : '.';
  }
  return printable;
}

std::string CountBytes(std::size_t count) {
  return std::to_string(count) + (count == 1 ? " byte" : " bytes");
}

std::string OnOff(std::uint8_t value) { return value != 0 ? "on" : "off"; }

std::string DescribeRequest(const PanelRequest& request) {
  const Bytes& payload = request.payload;
  const std::string sized = ", " + CountBytes(payload.size());
  switch (request.identifier) {
    case 'I':
      return "here is \"" + Printable(payload) + "\"";
    case 'C':
      if (payload.size() != 2) return "port control" + sized;
      return (payload[1] != 0 ? "take back Comm " : "give up Comm ") + std::to_string(payload[0]);
    case 'P':
      return "physical lights control " + (payload.size() == 1 ? OnOff(payload[0]) : sized.substr(2));
    case 'A':
      return "all lights off on disconnect";
    case 'L':
      return "lighting data" + sized;
    default:
      return "unknown" + sized;
  }
}

// What bytes on a connection mean: "request 1: give up Comm 3".
std::string DescribePanelBytes(PanelSide from, std::span<const std::uint8_t> bytes) {
  const std::optional<PanelRequest> frame = ParsePanelFrame(bytes);
  if (from == PanelSide::kPanel) {
    if (!frame) return CountBytes(bytes.size());
    const std::string reply = std::string("reply to ") + static_cast<char>(frame->sequence) + ": ";
    if (frame->identifier == '1') return reply + "done";
    return reply + (frame->identifier == '0' ? "refused" : "neither done nor refused");
  }
  if (!frame) return "no request";
  std::string text = std::string("request ") + static_cast<char>(frame->sequence) + ": ";
  if (!frame->nested) return text + DescribeRequest(*frame);
  const std::optional<PanelRequest> inner = ParsePanelFrame(frame->payload);
  return text + "repeats " + static_cast<char>(inner->sequence) +
         " inside, to no effect: " + DescribeRequest(*inner);
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
  print_(Columns(last_us_, from_ == LineSide::kProgram ? "program" : "unit", HexList(bytes, kShownOfPacket),
                 DescribePacket(from_, bytes) + (garbled ? " (garbled)" : "")));
}

std::string PrintPanelBytes(std::uint64_t at_us, PanelSide from, std::span<const std::uint8_t> bytes) {
  return Columns(at_us, from == PanelSide::kProgram ? "program" : "panel", HexList(bytes, kShownOfFrame),
                 DescribePanelBytes(from, bytes));
}

}  // namespace tendril
