// HwSerial: the serial link to the Nyx network. It owns one serial port, sends the unit commands, polls units
// and reports their replies.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
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
#include "serial/half_duplex_line.h"

namespace tendril {

// The port opens by itself when an operation has something to send. What passes through the open port is the
// HalfDuplexLine's: while a poll is outstanding, packets are held back and a second poll is refused.
//
// Every operation that fails raises a RuntimeError. Its description ends in one "Trace: ..." line for each operation
// that the failure passed through.
class HwSerial {
 public:
  // success: the unit answered. unit: the one that was polled. code: the poll's kind; for kinds 100 and 111
  // the code of the reply. data: what followed the reply's code. The link is idle when the handler is called: it may
  // poll again.
  using PollReplyHandler =
      std::function<void(bool success, std::uint8_t unit, std::uint8_t code, Bytes& data)>;

  // The result of a sequence download's poll of one unit.
  struct DownloadResult {
    std::uint8_t acknowledgement = 0;  // the reply's third byte, 0 when it had none
    bool timed_out = false;
  };
  // The result of the bootloader's last poll.
  struct BootloaderReply {
    Bytes data;
    bool received = false;
    bool timed_out = false;
  };

  // The device, the clock and the log must outlive the link.
  HwSerial(SerialDevice& device, TimerFactory& timers, Clock& clock, CommandLog& log);
  // Closes the port.
  ~HwSerial();

  // The handler of the poll replies. Returns the one before it, for a caller that listens in and passes them on.
  PollReplyHandler SetPollReplyHandler(PollReplyHandler handler) {
    return std::exchange(poll_reply_, std::move(handler));
  }
  // `handler` is called whenever the port has been opened (true) or the open port closed (false). It raises nothing.
  // It only asks the link; or it sets CommPort to 0, so that no command opens the port again.
  void SetPortHandler(std::function<void(bool open)> handler) { port_handler_ = std::move(handler); }
  // `observer` gets all that happens on the line; nullptr ends that.
  void SetLineObserver(LineObserver observer) { line_.SetObserver(std::move(observer)); }
  // `sink` gets the trace lines while TraceOutput is on.
  void SetTraceSink(std::function<void(const std::string&)> sink) { line_.SetTraceSink(std::move(sink)); }

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
  // Which device that is, for the user; empty when it does not exist.
  std::string DescribeComPort(std::int16_t number) const { return device_.Describe(number).Text(); }
  // Which other program has it open, where the system reports that.
  PortHolder ComPortHolder(std::int16_t number) const { return device_.Holder(number); }
  // As SerialDevice::WatchPorts().
  void WatchComPorts(const std::function<void()>& handler) { device_.WatchPorts(handler); }
  // Whether the port is open.
  bool PortOpen() const { return port_open_; }
  // True opens the port with the current settings, and does nothing when it is open with them already or when
  // CommPort is 0. A failure keeps the number of what failed (kErrPortAlreadyOpen, kErrInvalidPort ...) and
  // describes the port and the step. False closes it, and never fails.
  void SetPortOpen(bool open);
  // Asserts or clears the RTS line, opening the port if needed.
  void SetRTS(bool asserted);
  // Sends bytes as they are, or a text as one byte per character in the system's ANSI code. Nothing is sent,
  // and nothing fails, when there is nothing to send.
  void RawOutput(std::span<const std::uint8_t> bytes);
  void RawOutput(std::u16string_view text);

  // --- Properties ---

  // Whether heartbeats are sent.
  bool HeartBeat() const { return HeartBeatTimer_->Enabled(); }
  // While on, and while the port is open, a heartbeat goes to all units every 500 ms.
  void SetHeartBeat(bool on) { HeartBeatTimer_->SetEnabled(on); }
  // Whether each transmission and each poll's reply gives a trace line.
  bool TraceOutput() const { return line_.TraceOutput(); }
  void SetTraceOutput(bool on) { line_.SetTraceOutput(on); }
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
  // Zero bytes between the echo and the reply of the last poll. A count above 200 reads as 0, and is counted from 0
  // again.
  std::uint32_t LastPollPads() { return line_.LastPollPads(); }
  // Granularity of the clock and period of the system's timer, in milliseconds, as found at the start.
  std::uint32_t TickGranularity() const { return tick_granularity_ms_; }
  std::uint32_t TimerPeriod() const { return timer_period_ms_; }

  // --- Polls ---

  // Polls `unit` with `kind`. True: the poll went out, and exactly one PollReply will follow (none for kinds
  // 202 and 203). False: nothing was sent, because the unit ID is 0 or an earlier poll is outstanding. Raises
  // kErrPortNotOpen when no port is chosen.
  bool cmdPollStation(std::uint8_t unit, std::uint8_t kind);
  // Whether the reply to a poll, or its absence, is still to come.
  bool PollOutstanding() const { return line_.PollOutstanding(); }

  // Results of the polls of kind 202, by unit, and of kind 203.
  const DownloadResult& Download(std::uint8_t unit) const { return downloads_[unit]; }
  const BootloaderReply& Bootloader() const { return bootloader_; }

  // --- Configuration commands (hw_serial_commands.cpp); unit 0xFF addresses all units ---

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

  // While on, what would be transmitted is collected in the block buffer, for a download in one piece.
  void SetBlockCollection(bool on) { block_collection_ = on; }
  // Takes what was collected.
  Bytes TakeBlock() { return std::exchange(block_, {}); }

  // --- Light commands (hw_serial_lights.cpp); circuits from 0 ---

  // Intensities in percent (0 to 100; 255 passes through).
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

  // While on, light commands for circuits below 1024 are kept, the newest for each circuit, instead of being
  // sent.
  bool CommandBuffering() const { return command_buffering_; }
  void SetCommandBuffering(bool on) { command_buffering_ = on; }
  // What is kept.
  const CommandBuffer& Buffer() const { return command_buffer_; }
  // Not supported: raises kErrUnsupported and leaves the buffer as it is.
  void FlushCB();

 private:
  // The intensity argument of commands that have none.
  static constexpr std::uint8_t kNoIntensity = 255;

  void OpenPort();
  void ClosePort(LineEvent::Kind why = LineEvent::Kind::kClosed) noexcept;
  void OnDeviceEvent(SerialEvent event);
  void OnHeartbeatTimer();
  void OnPollEnd(HalfDuplexLine::PollResult result);

  // Hands a finished packet on: into the command buffer, or to XmitData. `circuit` is kUnitWide for commands
  // that concern the whole unit; these are noted in the command log. `intensity`, `two_byte_circuit` and `special`
  // are kept with a buffered command.
  void SendCommand(std::uint8_t unit, std::int16_t circuit, std::uint8_t code, std::uint8_t intensity,
                   const Bytes& packet, bool two_byte_circuit = false, std::uint8_t special = 0);
  void SendLight(std::string_view trace, std::uint8_t unit, std::int16_t circuit, std::uint8_t code,
                 Bytes body, std::uint8_t intensity = kNoIntensity);
  // The one way out for packets: sends or collects.
  void XmitData(std::span<const std::uint8_t> packet);

  SerialDevice& device_;
  Clock& clock_;
  CommandLog& log_;
  HalfDuplexLine line_;
  std::unique_ptr<Timer> HeartBeatTimer_;
  PollReplyHandler poll_reply_;
  std::function<void(bool)> port_handler_;

  std::int16_t comm_port_ = 0;
  std::int32_t baud_rate_ = 0;
  std::int16_t opened_port_ = 0;  // with which the port was last opened
  std::int32_t opened_speed_ = 0;
  bool port_open_ = false;

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

  std::array<DownloadResult, 256> downloads_{};
  BootloaderReply bootloader_;
};

}  // namespace tendril
