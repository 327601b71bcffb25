// HwSerial: the serial link to the Nyx network. It owns one serial port, sends the unit commands, polls units
// and reports their replies.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>

#include "platform/bytes.h"
#include "platform/clock.h"
#include "platform/serial_device.h"
#include "platform/timer.h"
#include "serial/command_buffer.h"
#include "serial/command_log.h"
#include "serial/reply_parser.h"

namespace tendril {

// The network is half-duplex: while RTS is asserted the program drives the line. A poll is the only exchange
// in which a unit answers; RTS is cleared when the poll's own echo has come back, which proves that its last
// byte has left, and asserted again when the poll ends.
//
//   Idle --poll written--> poll outstanding --reply complete, or time-out--> Idle
//
// While a poll is outstanding, packets are held back and go out when it ends, and a second poll is refused.
//
// The port opens by itself when an operation has something to send. Every operation that fails raises a
// RuntimeError whose description tells the way that the failure took, one "Trace: ..." line a level.
class HwSerial {
 public:
  // success: the unit answered. unit: the one that was polled. code: the poll's kind; for kinds 100 and 111
  // the code of the reply. data: what followed the reply's code. The link is idle when it is called: it may
  // poll again.
  using PollReplyHandler =
      std::function<void(bool success, std::uint8_t unit, std::uint8_t code, Bytes& data)>;

  // What came of a sequence download's poll of one unit.
  struct DownloadResult {
    std::uint8_t acknowledgement = 0;  // the reply's third byte, 0 when it had none
    bool timed_out = false;
  };
  // What came of the bootloader's last poll.
  struct BootloaderReply {
    Bytes data;
    bool received = false;
    bool timed_out = false;
  };

  // The device, the clock and the log must outlive the link.
  HwSerial(SerialDevice& device, TimerFactory& timers, Clock& clock, CommandLog& log);
  // Closes the port.
  ~HwSerial();
  HwSerial(const HwSerial&) = delete;
  HwSerial& operator=(const HwSerial&) = delete;

  // Who gets the poll replies; one host. Returns the one before, for who listens in and passes them on.
  PollReplyHandler SetPollReplyHandler(PollReplyHandler handler) {
    return std::exchange(poll_reply_, std::move(handler));
  }
  // Who is told when the open port has been closed, by whom and for what reason ever; one host. The handler
  // raises nothing and does not use the link.
  void SetPortClosedHandler(std::function<void()> handler) { port_closed_ = std::move(handler); }
  // Where trace lines go while TraceOutput is on.
  void SetTraceSink(std::function<void(const std::string&)> sink) { trace_sink_ = std::move(sink); }

  // --- The port ---

  // The port number asked for; 0: no port. Setting it re-opens an open port at once.
  std::int16_t CommPort() const { return comm_port_; }
  void SetCommPort(std::int16_t number);
  // The speed asked for in bit/s: 19200, 56000, 115200, 500000, 750000 or 1000000; with any other, opening
  // fails. Setting it re-opens an open port at once.
  std::int32_t BaudRate() const { return baud_rate_; }
  void SetBaudRate(std::int32_t baud);
  // Whether a device stands behind port `number`. Does not open it.
  bool ComPortExists(std::int16_t number) const { return device_.Exists(number); }
  // Which device that is, for a person; empty when it does not exist.
  std::string DescribeComPort(std::int16_t number) const { return device_.Describe(number); }
  // Whether the port is open.
  bool PortOpen() const { return port_open_; }
  // True opens the port with the current settings, and does nothing when it is open with them already or when
  // CommPort is 0. A failure keeps the number of what failed (kErrPortAlreadyOpen, kErrInvalidPort ...) and
  // tells the port and the step. False closes it, and never fails.
  void SetPortOpen(bool open);
  // Asserts or clears the RTS line, opening the port if needed.
  void SetRTS(bool asserted);
  // Sends bytes as they are, or a text as one byte per character in the system's ANSI code. Nothing is sent,
  // and nothing fails, when there is nothing to send.
  void RawOutput(std::span<const std::uint8_t> bytes);
  void RawOutput(std::u16string_view text);

  // --- Properties ---

  // Whether heartbeats are sent.
  bool HeartBeat() const { return heartbeat_timer_->Enabled(); }
  // While on, and while the port is open, a heartbeat goes to all units every 500 ms.
  void SetHeartBeat(bool on) { heartbeat_timer_->SetEnabled(on); }
  // Whether each transmission and each poll's reply gives a trace line.
  bool TraceOutput() const { return trace_output_; }
  void SetTraceOutput(bool on) { trace_output_ = on; }
  // Kept for the host; no effect here.
  bool InTestMode() const { return in_test_mode_; }
  void SetInTestMode(bool on) { in_test_mode_ = on; }
  // Protocol variants of the cards on the line. LongMsgs is the opposite of ShortMsgs.
  bool NewCards() const { return new_cards_; }
  void SetNewCards(bool on) { new_cards_ = on; }
  bool ShortMsgs() const { return short_msgs_; }
  void SetShortMsgs(bool on) { short_msgs_ = on; }
  bool LongMsgs() const { return !short_msgs_; }
  void SetLongMsgs(bool on) { short_msgs_ = !on; }
  // Bytes sent, counted as one less per packet. `reset` sets the count to 0 after it is read.
  double SentByteCount(bool reset = false);
  // Pad count that polls carry, 2 to 200; what is set is clamped to that. 45 at the start.
  std::uint8_t PollPad() const { return poll_pad_; }
  void SetPollPad(std::uint8_t pads);
  // Zero bytes between the echo and the reply of the last poll. A count above 200 reads as 0, and starts again
  // from 0.
  std::uint32_t LastPollPads();
  // Granularity of the clock and period of the system's timer, in milliseconds, as found at the start.
  std::uint32_t TickGranularity() const { return tick_granularity_ms_; }
  std::uint32_t TimerPeriod() const { return timer_period_ms_; }

  // --- Commands (hw_serial_commands.cpp); unit 0xFF addresses all units ---

  // Intensities in percent (0 to 100; 255 passes through), circuits from 0.
  void cmdSetIntensity(std::uint8_t unit, std::int16_t circuit, std::uint8_t intensity);
  // `value` 0 to 255.
  void CmdSetDMXIntensity(std::uint8_t unit, std::int16_t circuit, std::uint8_t value);
  // A `time` of 0 fails.
  void cmdFade(std::uint8_t unit, std::int16_t circuit, std::uint8_t time, std::uint8_t from,
               std::uint8_t to);
  // Effects on one circuit.
  void cmdSetTwinkle(std::uint8_t unit, std::int16_t circuit);
  void cmdSetShimmer(std::uint8_t unit, std::int16_t circuit);
  // Not supported: raise kErrUnsupported.
  void cmdSetTwinkleSpecial(std::uint8_t unit, std::int16_t circuit, std::uint8_t a, std::uint8_t b,
                            std::uint8_t c);
  void cmdSetShimmerSpecial(std::uint8_t unit, std::int16_t circuit, std::uint8_t a, std::uint8_t b,
                            std::uint8_t c);
  // Makes the unit take the configuration command that follows.
  void SendUnlockCmd(std::uint8_t unit);
  // Unlocks the unit and gives it a new ID; then, when asked to, polls the new ID with kind 2.
  void cmdSetAddress(std::uint8_t unit, std::uint8_t new_id, bool poll_after);
  // Unlocks the unit and sets one option.
  void cmdSetoption(std::uint8_t unit, std::int16_t circuit, std::uint8_t b1, std::uint8_t b2,
                    std::uint8_t b3, std::uint8_t b4, std::uint8_t b5);
  // Unlocks the unit and sends five option bytes and up to 25 more, of which those before the first 0 go out.
  // More than 25 raise kErrOutOfRange.
  void cmdSetManyOptions(std::uint8_t unit, std::int16_t circuit, std::uint8_t b1, std::uint8_t b2,
                         std::uint8_t b3, std::uint8_t b4, std::uint8_t b5,
                         std::span<const std::uint8_t> more);

  // While on, light commands for circuits below 1024 are kept, the newest for each circuit, instead of being
  // sent.
  bool CommandBuffering() const { return command_buffering_; }
  void SetCommandBuffering(bool on) { command_buffering_ = on; }
  // What is kept.
  const CommandBuffer& Buffer() const { return command_buffer_; }
  // Not supported: raises kErrUnsupported and leaves the buffer as it is.
  void FlushCB();

  // While on, what would be transmitted is collected in the block buffer, for a download in one piece.
  void SetBlockCollection(bool on) { block_collection_ = on; }
  // Takes what was collected.
  Bytes TakeBlock();

  // --- Polls (hw_serial_poll.cpp) ---

  // Polls `unit` with `kind`. True: the poll went out, and exactly one PollReply will follow (none for kinds
  // 202 and 203). False: nothing was sent, because the unit ID is 0 or an earlier poll is outstanding. Raises
  // kErrPortNotOpen when no port is chosen.
  bool cmdPollStation(std::uint8_t unit, std::uint8_t kind);
  // Whether a poll waits for its reply or its time-out.
  bool PollOutstanding() const { return poll_.has_value(); }

  // Results of the polls of kind 202, by unit, and of kind 203.
  const DownloadResult& Download(std::uint8_t unit) const { return downloads_[unit]; }
  const BootloaderReply& Bootloader() const { return bootloader_; }

 private:
  // Bytes that must wait before the device reports them: while no poll is outstanding, and while one is.
  static constexpr std::int32_t kIdleReceiveThreshold = 4000;
  static constexpr std::int32_t kPollReceiveThreshold = 1;

  struct Poll {
    std::uint8_t unit;
    std::uint8_t kind;
    std::uint32_t start_ms;
    std::uint32_t time_out_ms;
    // The port was closed since: whatever line is open now, this poll has no part in it.
    bool line_closed = false;
  };

  void OpenPort();
  void ClosePort() noexcept;
  // `line` composes the trace line; it runs only when somebody reads it.
  template <typename Line>
  void Trace(Line&& line) const {
    if (trace_output_ && trace_sink_) trace_sink_(line());
  }

  // Hands a finished packet on: into the command buffer, or to XmitData. `circuit` is kUnitWide for commands
  // that concern the whole unit; these are noted in the command log.
  void SendCommand(std::uint8_t unit, std::int16_t circuit, std::uint8_t code, std::uint8_t intensity,
                   const Bytes& packet, bool two_byte_circuit = false, std::uint8_t special = 0);
  // The one way out for packets: sends, collects or holds back.
  void XmitData(std::span<const std::uint8_t> packet);

  void OnDeviceEvent(SerialEvent event);
  void OnPollTimer();
  void OnHeartbeatTimer();
  std::uint32_t PollTimeOutMs(std::uint8_t kind) const;
  // Asserts RTS again after a reply, or before the next packet when the adapter refused it then.
  void TakeLineBack() noexcept;
  // Whether the poll is out on the line that is open now: packets wait for it, and its reply is listened for.
  bool PollOnLine() const { return poll_ && !poll_->line_closed; }
  bool TakeReply();
  void CompletePoll();
  void TimeOutPoll();
  Poll EndPoll();
  void WriteHeldBack();
  void RaisePollReply(bool success, std::uint8_t unit, std::uint8_t code, Bytes data);

  SerialDevice& device_;
  Clock& clock_;
  CommandLog& log_;
  std::unique_ptr<Timer> poll_timer_;
  std::unique_ptr<Timer> heartbeat_timer_;
  PollReplyHandler poll_reply_;
  std::function<void()> port_closed_;
  std::function<void(const std::string&)> trace_sink_;

  std::int16_t comm_port_ = 0;
  std::int32_t baud_rate_ = 0;
  std::int16_t opened_port_ = 0;  // with which the port was last opened
  std::int32_t opened_speed_ = 0;
  bool port_open_ = false;
  bool line_released_ = false;  // RTS was cleared for a reply, and has not been asserted since

  bool trace_output_ = false;
  bool in_test_mode_ = false;
  bool new_cards_ = true;
  bool short_msgs_ = false;
  double sent_byte_count_ = 0;  // a double, since it never starts over
  std::uint8_t poll_pad_ = 45;
  std::uint32_t timer_period_ms_;
  std::uint32_t tick_granularity_ms_;

  bool command_buffering_ = false;
  CommandBuffer command_buffer_;
  bool block_collection_ = false;
  Bytes block_;

  std::optional<Poll> poll_;  // the outstanding one
  ReplyParser parser_;        // of the outstanding poll, or the last
  // Packets held back during the poll. Ends in one spare 0x00, which the next packet starts on: two packets
  // share the zero between them.
  Bytes held_back_{0};

  std::array<DownloadResult, 256> downloads_{};
  BootloaderReply bootloader_;
};

}  // namespace tendril
