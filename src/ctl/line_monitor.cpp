#include "ctl/line_monitor.h"

#include <cstddef>
#include <span>
#include <utility>

#include "serial/packets.h"

namespace tendril::ctl {
namespace {

// A unit that sends slowly leaves some 30 ms between two bytes of a packet.
constexpr std::int32_t kPauseMs = 100;
constexpr std::size_t kShortestPacket = 2;  // an address and a code

TraceEntry::Kind KindOf(std::span<const std::uint8_t> bytes) {
  if (bytes.back() != kFrameByte) return TraceEntry::Kind::kNoise;
  if (IsReply(bytes)) return TraceEntry::Kind::kReply;
  const std::size_t content = bytes.size() - LeadingZeros(bytes);
  return content > kShortestPacket ? TraceEntry::Kind::kSent : TraceEntry::Kind::kNoise;
}

}  // namespace

LineMonitor::LineMonitor(Environment& environment, EntryHandler on_entry)
    : environment_(environment),
      on_entry_(std::move(on_entry)),
      pause_(environment.timers.CreateTimer([this] { Flush(); })) {
  pause_->SetInterval(kPauseMs);
  environment_.device.SetEventHandler([this](SerialEvent event) { OnEvent(event); });
  environment_.device.SetReceiveThreshold(1);
}

LineMonitor::~LineMonitor() { environment_.device.SetEventHandler(nullptr); }

void LineMonitor::OnEvent(SerialEvent event) {
  switch (event) {
    case SerialEvent::kDataReceived:
    case SerialEvent::kReceiveOverflow:
      return Read();
    case SerialEvent::kDeviceLost:
      lost_ = true;
      return Flush();
  }
}

void LineMonitor::Read() {
  for (const std::uint8_t byte : environment_.device.ReadAll()) {
    if (bytes_.Push(byte) || bytes_.Size() >= TraceEntry::kMaxBytes) Flush();
  }
  pause_->SetEnabled(!bytes_.Empty());
}

void LineMonitor::Flush() {
  pause_->SetEnabled(false);
  if (bytes_.Empty()) return;
  const auto size = static_cast<std::uint32_t>(bytes_.Size());
  Bytes bytes = bytes_.Take();
  const TraceEntry::Kind kind = KindOf(bytes);
  on_entry_(
      {.number = 0, .time_ms = environment_.now_ms(), .kind = kind, .size = size, .bytes = std::move(bytes)});
}

}  // namespace tendril::ctl
