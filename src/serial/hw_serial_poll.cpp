// HwSerial's polls: the request, the reply or its absence, and what was held back meanwhile.
#include <array>
#include <utility>

#include "platform/hex_text.h"
#include "platform/rounding.h"
#include "platform/runtime_error.h"
#include "serial/hw_serial.h"
#include "serial/packets.h"

namespace tendril {
namespace {

// Kinds of poll whose results are kept here instead of being told to the host.
constexpr std::uint8_t kKindDownload = 202;
constexpr std::uint8_t kKindBootloader = 203;
// Kinds that report the code of the reply in place of their own.
constexpr std::uint8_t kKindStatus = 100;
constexpr std::uint8_t kKindReplyCode = 111;
// The reply codes that a poll of kind 100 can have.
constexpr std::uint8_t kFirstStatusCode = 101;
constexpr std::uint8_t kLastStatusCode = 104;

// Room for the poll and its reply in the time-out, in bytes, beside the pads.
constexpr double kPollAndReplyBytes = 38;
constexpr double kBitsPerByte = 10;
// Some kinds make the unit do something before it answers.
constexpr std::uint32_t kSlowKindExtraMs = 250;

constexpr std::uint32_t kMaxPlausiblePads = 200;

bool IsSlowKind(std::uint8_t kind) { return kind == '2' || kind == '1' || kind == 'A' || kind == 'o'; }

// Runs what may fail in the receive handling, where failures are ignored. They show by themselves: the poll ends
// without a reply, or the next packet cannot be sent.
template <typename Action>
void IgnoreFailure(Action&& action) noexcept {
  try {
    action();
  } catch (...) {
    return;
  }
}

}  // namespace

bool HwSerial::cmdPollStation(std::uint8_t unit, std::uint8_t kind) {
  if (unit == 0 || poll_) return false;
  OpenPort();
  if (!port_open_) throw RuntimeError(kErrPortNotOpen, "No serial port is open");

  poll_ = Poll{.unit = unit, .kind = kind, .start_ms = clock_.NowMs(), .time_out_ms = 0};
  parser_.Start(unit);
  try {
    device_.ClearInput();
    device_.SetReceiveThreshold(kPollReceiveThreshold);
    const Bytes packet = PollPacket(unit, kind, poll_pad_);
    if (line_released_) TakeLineBack();
    device_.Write(packet);
    Trace([&] { return "POLL[" + std::to_string(poll_->start_ms) + "](" + HexList(packet, ',') + ")"; });
    poll_->time_out_ms = PollTimeOutMs(kind);
  } catch (...) {
    poll_.reset();
    device_.SetReceiveThreshold(kIdleReceiveThreshold);
    throw;
  }
  poll_timer_->SetInterval(static_cast<std::int32_t>(poll_->time_out_ms));
  poll_timer_->SetEnabled(true);
  return true;
}

std::uint32_t HwSerial::PollTimeOutMs(std::uint8_t kind) const {
  const double bytes = static_cast<double>(device_.PendingOutput()) + kPollAndReplyBytes + poll_pad_;
  // Twice what poll and reply take on the line.
  const double ms = bytes * kBitsPerByte * 1000 / opened_speed_ * 2;
  return static_cast<std::uint32_t>(RoundHalfToEven(ms)) + (IsSlowKind(kind) ? kSlowKindExtraMs : 0);
}

void HwSerial::OnDeviceEvent(SerialEvent event) {
  switch (event) {
    case SerialEvent::kDataReceived:
      if (!PollOnLine()) {
        IgnoreFailure([&] { device_.ClearInput(); });
      } else if (TakeReply()) {
        CompletePoll();
      }
      break;
    case SerialEvent::kReceiveOverflow:
      IgnoreFailure([&] { device_.ClearInput(); });
      break;
    case SerialEvent::kDeviceLost:
      ClosePort();
      break;
  }
}

// Feeds what has arrived to the parser; true when the reply is complete.
bool HwSerial::TakeReply() {
  Bytes received;
  IgnoreFailure([&] { received = device_.ReadAll(); });
  if (received.empty()) return false;
  Trace([&] {
    return "Poll read " + std::to_string(received.size()) + " bytes (" + HexList(received, ',') + ")";
  });
  for (const std::uint8_t byte : received) {
    switch (parser_.Push(byte)) {
      case ReplyParser::Verdict::kNeedMore:
        break;
      case ReplyParser::Verdict::kEchoSeen:
        line_released_ = true;
        IgnoreFailure([&] { device_.SetRts(false); });
        break;
      case ReplyParser::Verdict::kReplyComplete:
        return true;
    }
  }
  return false;
}

void HwSerial::CompletePoll() {
  Trace([&] {
    return "Poll Took - " + std::to_string(clock_.NowMs() - poll_->start_ms) + "ms, received " +
           std::to_string(parser_.pads()) + " nulls";
  });
  TakeLineBack();
  IgnoreFailure([&] { device_.Write(std::array{kFrameByte, kFrameByte}); });
  WriteHeldBack();
  const Poll poll = EndPoll();

  const std::uint8_t code = parser_.code();
  const Bytes& data = parser_.data();
  switch (poll.kind) {
    case kKindStatus:
      if (code >= kFirstStatusCode && code <= kLastStatusCode) {
        RaisePollReply(true, poll.unit, code, data);
      } else {
        RaisePollReply(false, poll.unit, poll.kind, data);
      }
      break;
    case kKindReplyCode:
      RaisePollReply(true, poll.unit, code, data);
      break;
    case kKindDownload:
      downloads_[poll.unit] = {.acknowledgement = data.size() > 2 ? data[2] : std::uint8_t{0}};
      break;
    case kKindBootloader:
      bootloader_ = {.data = data, .received = true};
      Trace([] { return std::string("Poll Data Received"); });
      break;
    default:
      RaisePollReply(true, poll.unit, poll.kind, data);
      break;
  }
}

void HwSerial::OnPollTimer() {
  if (!poll_ || clock_.NowMs() - poll_->start_ms < poll_->time_out_ms) return;
  // What has arrived counts, even if nobody had the time to look at it.
  if (PollOnLine() && TakeReply()) {
    CompletePoll();
  } else {
    TimeOutPoll();
  }
}

void HwSerial::TimeOutPoll() {
  if (PollOnLine()) {
    TakeLineBack();
    WriteHeldBack();
    // Before the host hears of it: the host may poll again, and must not find this byte in the middle.
    IgnoreFailure([&] { device_.Write(std::array{kFrameByte}); });
  }
  const Poll poll = EndPoll();

  switch (poll.kind) {
    case kKindDownload:
      downloads_[poll.unit] = {.timed_out = true};
      break;
    case kKindBootloader:
      bootloader_ = {.data = {}, .timed_out = true};
      break;
    default:
      RaisePollReply(false, poll.unit, poll.kind, parser_.data());
      break;
  }
}

// Back to idle: from here on the host may poll again.
HwSerial::Poll HwSerial::EndPoll() {
  poll_timer_->SetEnabled(false);
  const Poll poll = *std::exchange(poll_, std::nullopt);
  device_.SetReceiveThreshold(kIdleReceiveThreshold);
  return poll;
}

void HwSerial::TakeLineBack() noexcept {
  IgnoreFailure([&] {
    device_.SetRts(true);
    line_released_ = false;
  });
}

void HwSerial::WriteHeldBack() {
  if (held_back_.size() == 1) return;
  const Bytes held_back = std::exchange(held_back_, Bytes{kFrameByte});
  IgnoreFailure([&] { device_.Write(held_back); });
  IgnoreFailure([&] { device_.Write(std::array{kFrameByte}); });
}

void HwSerial::RaisePollReply(bool success, std::uint8_t unit, std::uint8_t code, Bytes data) {
  if (poll_reply_) poll_reply_(success, unit, code, data);
}

std::uint32_t HwSerial::LastPollPads() {
  if (parser_.pads() > kMaxPlausiblePads) parser_.ResetPads();
  return parser_.pads();
}

void HwSerial::OnHeartbeatTimer() {
  if (port_open_) IgnoreFailure([&] { XmitData(HeartbeatPacket()); });
}

}  // namespace tendril
