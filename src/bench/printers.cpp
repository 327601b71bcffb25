#include "bench/printers.h"

#include <algorithm>
#include <cstdio>
#include <optional>
#include <span>
#include <string_view>
#include <utility>

#include "trace/packet_meaning.h"

namespace tendril {
namespace {

constexpr std::size_t kShownOfPacket = 40;   // more than any packet has; noise can be much longer
constexpr std::size_t kShownOfFrame = 24;    // more than any frame but those with a text or lighting data
constexpr std::uint64_t kSilenceUs = 2'000;  // zero bytes this far apart do not belong together
constexpr std::size_t kHexWidth = 47;        // of a packet of 16 bytes, as those with a port's options are

std::string Columns(std::uint64_t at_us, const char* from, std::string hex, const std::string& meaning) {
  char time_and_side[32];
  std::snprintf(time_and_side, sizeof time_and_side, "%12.6f  %-9s", static_cast<double>(at_us) / 1e6, from);
  hex.resize(std::max(hex.size(), kHexWidth), ' ');
  return time_and_side + hex + "  " + meaning;
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
  const bool apart = !packet_.HasContent() && byte.at_us - last_us_ > kSilenceUs;
  if (byte.from != from_ || apart) Flush();
  from_ = byte.from;
  last_us_ = byte.at_us;
  garbled_ = garbled_ || byte.garbled;
  if (packet_.Push(byte.value)) Flush();
}

void LinePrinter::Flush() {
  const Bytes bytes = packet_.Take();
  const bool garbled = std::exchange(garbled_, false);
  if (bytes.empty()) return;
  print_(Columns(last_us_, from_ == LineSide::kProgram ? "program" : "unit",
                 ShownBytes(bytes, kShownOfPacket, bytes.size()),
                 (from_ == LineSide::kProgram ? DescribeSent(bytes) : DescribeReceived(bytes)) +
                     (garbled ? " (garbled)" : "")));
}

std::string PrintPanelBytes(std::uint64_t at_us, PanelSide from, std::span<const std::uint8_t> bytes) {
  return Columns(at_us, from == PanelSide::kProgram ? "program" : "panel",
                 ShownBytes(bytes, kShownOfFrame, bytes.size()), DescribePanelBytes(from, bytes));
}

}  // namespace tendril
