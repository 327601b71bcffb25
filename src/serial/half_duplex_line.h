// HalfDuplexLine: the open line to the network: when the program may talk on it, and the polls.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <utility>

#include "platform/bytes.h"
#include "platform/clock.h"
#include "platform/serial_device.h"
#include "platform/timer.h"
#include "serial/line_event.h"
#include "serial/reply_parser.h"

namespace tendril {

// While RTS is asserted the program drives the line. A poll is the only exchange in which a unit answers: RTS is
// cleared when the poll's own echo has come back, which proves that its last byte has left, and asserted again when the
// poll ends.
//
//   Idle --poll written--> poll outstanding --reply complete, or time-out--> Idle
//
// While a poll is outstanding, packets are held back. They go out when it ends. All bytes of the line, in both
// directions, pass through this class.
//
// The owner opens and closes the device, and reports both here.
class HalfDuplexLine {
 public:
  // How a poll ended.
  struct PollResult {
    std::uint8_t unit;
    std::uint8_t kind;
    bool replied;       // false: time-out
    std::uint8_t code;  // the reply's first byte
    Bytes data;         // what followed it; after a time-out, what came so far
  };

  // Bytes that must wait before the device reports them while no poll is outstanding.
  static constexpr std::int32_t kIdleReceiveThreshold = 4000;

  // The device and the clock must outlive the line. `on_poll_end` is called once for each poll. The line is idle by
  // then: the next poll may start.
  HalfDuplexLine(SerialDevice& device, TimerFactory& timers, Clock& clock,
                 std::function<void(PollResult)> on_poll_end);

  // Asserts or clears RTS. Raises what the device raises.
  void SetRts(bool asserted);
  // The port has been closed. Packets that are held back are dropped; an outstanding poll ends by its time-out.
  void OnClosed() noexcept;
  // The device reports received data.
  void OnDataReceived();
  // Drops what was received. Never fails.
  void DiscardInput() noexcept;

  // Writes a packet, or holds it back. Raises what the device raises.
  void Write(std::span<const std::uint8_t> packet);

  // Polls `unit`. No poll may be outstanding. `pads`: the pad count. `baud`: the line's speed, for the time-out.
  // Raises what the device raises; no poll is outstanding then.
  void StartPoll(std::uint8_t unit, std::uint8_t kind, std::uint8_t pads, std::int32_t baud);
  // Whether a poll waits for its reply or its time-out.
  bool PollOutstanding() const { return poll_.has_value(); }
  // Zero bytes between the echo and the reply of the last poll. A count above 200 reads as 0, and is counted from 0
  // again.
  std::uint32_t LastPollPads();

  // Reports all that happens on the line.
  void SetObserver(LineObserver observer) { observer_ = std::move(observer); }
  void Report(const LineEvent& event) const {
    if (observer_) observer_(event);
  }
  // `sink` gets a line for each transmission and each poll's reply while the trace is on.
  void SetTraceSink(std::function<void(const std::string&)> sink) { trace_sink_ = std::move(sink); }
  bool TraceOutput() const { return trace_output_; }
  void SetTraceOutput(bool on) { trace_output_ = on; }
  // `line` composes a trace line; it is called only when the line is wanted.
  template <typename Line>
  void Trace(Line&& line) const {
    if (trace_output_ && trace_sink_) trace_sink_(line());
  }

 private:
  struct Poll {
    std::uint8_t unit;
    std::uint8_t kind;
    std::uint32_t start_ms;
    std::uint32_t time_out_ms;
    // The port was closed since: the poll has no part in the line that is open now.
    bool line_closed = false;
  };

  std::uint32_t PollTimeOutMs(std::uint8_t kind, std::uint8_t pads, std::int32_t baud) const;
  void OnPollTimer();
  bool TakeReply();
  void Send(std::span<const std::uint8_t> bytes, LineEvent::Kind kind = LineEvent::Kind::kSent);
  void Drive(bool asserted);
  void ReportInput();
  void EndPoll(bool replied);
  void WriteHeldBack();
  // Asserts RTS again after a reply, or before the next packet when the adapter refused it then.
  void TakeLineBack() noexcept;
  // Whether the poll is out on the line that is open now: packets wait for it, and its reply is listened for.
  bool PollOnLine() const { return poll_ && !poll_->line_closed; }

  SerialDevice& device_;
  Clock& clock_;
  std::function<void(PollResult)> on_poll_end_;
  std::unique_ptr<Timer> PollTimer_;
  LineObserver observer_;
  std::function<void(const std::string&)> trace_sink_;
  bool trace_output_ = false;

  bool line_released_ = false;  // RTS was cleared for a reply, and has not been asserted since
  std::optional<Poll> poll_;    // the outstanding one
  ReplyParser parser_;          // of the outstanding poll, or the last
  // Packets held back during the poll. Ends in one spare 0x00, which the next packet starts on: two packets
  // share the zero between them.
  Bytes held_back_{0};
};

}  // namespace tendril
