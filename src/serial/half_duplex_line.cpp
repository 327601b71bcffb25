#include "serial/half_duplex_line.h"

#include <array>

#include "platform/hex_text.h"
#include "platform/rounding.h"
#include "platform/runtime_error.h"
#include "serial/packets.h"

namespace tendril {
namespace {

// The receive threshold while a poll is outstanding: every byte.
constexpr std::int32_t kPollReceiveThreshold = 1;

// Room for the poll and its reply in the time-out, in bytes, beside the pads.
constexpr double kPollAndReplyBytes = 38;
constexpr double kBitsPerByte = 10;
// Some kinds make the unit do something before it answers.
constexpr std::uint32_t kSlowKindExtraMs = 250;

constexpr std::uint32_t kMaxPlausiblePads = 200;

bool IsSlowKind(std::uint8_t kind) { return kind == '2' || kind == '1' || kind == 'A' || kind == 'o'; }

// Failures in the receive handling are ignored. They show later: the poll ends without a reply, or the next packet
// cannot be sent.
template <typename Action>
void IgnoreFailure(Action&& action) noexcept {
  try {
    action();
  } catch (...) {
    return;
  }
}

}  // namespace

HalfDuplexLine::HalfDuplexLine(SerialDevice& device, TimerFactory& timers, Clock& clock,
                               std::function<void(PollResult)> on_poll_end)
    : device_(device),
      clock_(clock),
      on_poll_end_(std::move(on_poll_end)),
      PollTimer_(timers.CreateTimer([this] { OnPollTimer(); })) {}

void HalfDuplexLine::SetRts(bool asserted) {
  Drive(asserted);
  line_released_ = false;  // the line is as the owner wants it
}

void HalfDuplexLine::Drive(bool asserted) {
  try {
    device_.SetRts(asserted);
  } catch (...) {
    Report({.kind = LineEvent::Kind::kFault, .text = "RTS is not set: " + DescribeCurrentFault()});
    throw;
  }
  Report({.kind = asserted ? LineEvent::Kind::kRtsOn : LineEvent::Kind::kRtsOff});
}

void HalfDuplexLine::Send(std::span<const std::uint8_t> bytes, LineEvent::Kind kind) {
  try {
    device_.Write(bytes);
  } catch (...) {
    Report({.kind = LineEvent::Kind::kFault, .text = "nothing is sent: " + DescribeCurrentFault()});
    throw;
  }
  Report({.kind = kind, .bytes = bytes});
}

// What is about to be dropped, for those who watch the line: echoes, and replies that came too late.
void HalfDuplexLine::ReportInput() {
  if (!observer_) return;
  Bytes received;
  IgnoreFailure([&] { received = device_.ReadAll(); });
  if (!received.empty()) Report({.kind = LineEvent::Kind::kDropped, .bytes = received});
}

void HalfDuplexLine::TakeLineBack() noexcept {
  IgnoreFailure([&] { SetRts(true); });
}

void HalfDuplexLine::OnClosed() noexcept {
  held_back_.assign(1, kFrameByte);
  if (poll_) poll_->line_closed = true;
}

void HalfDuplexLine::DiscardInput() noexcept {
  ReportInput();
  IgnoreFailure([&] { device_.ClearInput(); });
}

void HalfDuplexLine::Write(std::span<const std::uint8_t> packet) {
  if (PollOnLine()) {
    held_back_.pop_back();
    held_back_.insert(held_back_.end(), packet.begin(), packet.end());
    if (packet.back() != kFrameByte) held_back_.push_back(kFrameByte);
    return;
  }
  if (line_released_) TakeLineBack();
  Send(packet);
  Trace([&] { return "Write[" + std::to_string(clock_.NowMs()) + "](" + HexList(packet, ',') + ")"; });
}

void HalfDuplexLine::StartPoll(std::uint8_t unit, std::uint8_t kind, std::uint8_t pads, std::int32_t baud) {
  poll_ = Poll{.unit = unit, .kind = kind, .start_ms = clock_.NowMs(), .time_out_ms = 0};
  parser_.Start(unit);
  try {
    ReportInput();
    device_.ClearInput();
    device_.SetReceiveThreshold(kPollReceiveThreshold);
    const Bytes packet = PollPacket(unit, kind, pads);
    if (line_released_) TakeLineBack();
    Send(packet, LineEvent::Kind::kPollSent);
    Trace([&] { return "POLL[" + std::to_string(poll_->start_ms) + "](" + HexList(packet, ',') + ")"; });
    poll_->time_out_ms = PollTimeOutMs(kind, pads, baud);
  } catch (...) {
    poll_.reset();
    device_.SetReceiveThreshold(kIdleReceiveThreshold);
    throw;
  }
  PollTimer_->SetInterval(static_cast<std::int32_t>(poll_->time_out_ms));
  PollTimer_->SetEnabled(true);
}

std::uint32_t HalfDuplexLine::PollTimeOutMs(std::uint8_t kind, std::uint8_t pads, std::int32_t baud) const {
  const double bytes = static_cast<double>(device_.PendingOutput()) + kPollAndReplyBytes + pads;
  // Twice what poll and reply take on the line.
  const double ms = bytes * kBitsPerByte * 1000 / baud * 2;
  return static_cast<std::uint32_t>(RoundHalfToEven(ms)) + (IsSlowKind(kind) ? kSlowKindExtraMs : 0);
}

void HalfDuplexLine::OnDataReceived() {
  if (!PollOnLine()) {
    DiscardInput();
  } else if (TakeReply()) {
    EndPoll(true);
  }
}

void HalfDuplexLine::OnPollTimer() {
  if (!poll_ || clock_.NowMs() - poll_->start_ms < poll_->time_out_ms) return;
  // What has arrived counts, even if it has not been reported yet.
  EndPoll(PollOnLine() && TakeReply());
}

// Feeds what has arrived to the parser; true when the reply is complete.
bool HalfDuplexLine::TakeReply() {
  Bytes received;
  IgnoreFailure([&] { received = device_.ReadAll(); });
  if (received.empty()) return false;
  Trace([&] {
    return "Poll read " + std::to_string(received.size()) + " bytes (" + HexList(received, ',') + ")";
  });
  std::span<const std::uint8_t> unreported = received;
  bool complete = false;
  for (std::size_t i = 0; i < received.size() && !complete; ++i) {
    switch (parser_.Push(received[i])) {
      case ReplyParser::Verdict::kNeedMore:
        break;
      case ReplyParser::Verdict::kEchoSeen:
        Report({.kind = LineEvent::Kind::kReceived, .bytes = std::span(received).first(i + 1)});
        unreported = std::span(received).subspan(i + 1);
        line_released_ = true;
        IgnoreFailure([&] { Drive(false); });
        break;
      case ReplyParser::Verdict::kReplyComplete:
        complete = true;
        break;
    }
  }
  if (!unreported.empty()) Report({.kind = LineEvent::Kind::kReceived, .bytes = unreported});
  return complete;
}

void HalfDuplexLine::EndPoll(bool replied) {
  if (replied) {
    Trace([&] {
      return "Poll Took - " + std::to_string(clock_.NowMs() - poll_->start_ms) + "ms, received " +
             std::to_string(parser_.pads()) + " nulls";
    });
  }
  if (PollOnLine()) {
    if (!replied) Report({.kind = LineEvent::Kind::kTimeOut});
    TakeLineBack();
    if (replied) IgnoreFailure([&] { Send(std::array{kFrameByte, kFrameByte}); });
    WriteHeldBack();
    // Before the host is notified: it may poll again, and this byte must not land in the middle of that.
    if (!replied) IgnoreFailure([&] { Send(std::array{kFrameByte}); });
  }
  PollTimer_->SetEnabled(false);
  const Poll poll = *std::exchange(poll_, std::nullopt);
  device_.SetReceiveThreshold(kIdleReceiveThreshold);
  on_poll_end_({poll.unit, poll.kind, replied, parser_.code(), parser_.data()});
}

void HalfDuplexLine::WriteHeldBack() {
  if (held_back_.size() == 1) return;
  const Bytes held_back = std::exchange(held_back_, Bytes{kFrameByte});
  IgnoreFailure([&] { Send(held_back); });
  IgnoreFailure([&] { Send(std::array{kFrameByte}); });
}

std::uint32_t HalfDuplexLine::LastPollPads() {
  if (parser_.pads() > kMaxPlausiblePads) parser_.ResetPads();
  return parser_.pads();
}

}  // namespace tendril
