#include "serial/hw_serial.h"

#include <algorithm>
#include <array>

#include "platform/ansi_text.h"
#include "platform/runtime_error.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr std::int32_t kHeartbeatPeriodMs = 500;

// The only speeds that give a valid settings text.
constexpr std::array kSpeeds{19200, 56000, 115200, 500000, 750000, 1000000};

// Kinds of poll whose results are kept here instead of being reported to the host.
constexpr std::uint8_t kKindDownload = 202;
constexpr std::uint8_t kKindBootloader = 203;
// Kinds that report the code of the reply in place of their own.
constexpr std::uint8_t kKindStatus = 100;
constexpr std::uint8_t kKindReplyCode = 111;
// The reply codes that a poll of kind 100 can have.
constexpr std::uint8_t kFirstStatusCode = 101;
constexpr std::uint8_t kLastStatusCode = 104;

}  // namespace

HwSerial::HwSerial(SerialDevice& device, TimerFactory& timers, Clock& clock, CommandLog& log)
    : device_(device),
      clock_(clock),
      log_(log),
      line_(device, timers, clock,
            [this](HalfDuplexLine::PollResult result) { OnPollEnd(std::move(result)); }),
      HeartBeatTimer_(timers.CreateTimer([this] { OnHeartbeatTimer(); })),
      timer_period_ms_(clock.RequestFinestTimerPeriod()),
      tick_granularity_ms_(clock.GranularityMs()) {
  HeartBeatTimer_->SetInterval(kHeartbeatPeriodMs);
  device_.SetEventHandler([this](SerialEvent event) { OnDeviceEvent(event); });
}

HwSerial::~HwSerial() {
  ClosePort();
  device_.SetEventHandler(nullptr);
  clock_.ReleaseTimerPeriod(timer_period_ms_);
}

void HwSerial::SetCommPort(std::int16_t number) {
  Traced("Trace: Let CommPort", [&] {
    (void)ComPortExists(number);  // asked at every choice; the answer that counts comes with the opening
    comm_port_ = number;
    if (port_open_) OpenPort();
  });
}

void HwSerial::SetBaudRate(std::int32_t baud) {
  Traced("Trace: Let BaudRate", [&] {
    baud_rate_ = baud;
    if (port_open_) OpenPort();
  });
}

void HwSerial::SetPortOpen(bool open) {
  if (open) {
    OpenPort();
  } else {
    ClosePort();
  }
}

void HwSerial::OpenPort() {
  if (port_open_ && opened_port_ == comm_port_ && opened_speed_ == baud_rate_) return;
  if (port_open_) ClosePort();
  if (comm_port_ == 0) return;

  const std::string port = std::to_string(comm_port_);
  std::string stage = "Setting Baud Rate";
  try {
    const bool valid = std::find(kSpeeds.begin(), kSpeeds.end(), baud_rate_) != kSpeeds.end();
    const std::string settings = (valid ? std::to_string(baud_rate_) : "") + ",N,8,1";
    opened_speed_ = baud_rate_;
    stage = "Setting(" + settings + ")";
    if (!valid) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
    stage = "Setting Port = " + port;
    if (comm_port_ < 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
    opened_port_ = comm_port_;
    stage = "Setting misc Comm Settings";
    device_.SetReceiveThreshold(HalfDuplexLine::kIdleReceiveThreshold);
    stage = "Executing Port Open Property";
    device_.Open(opened_port_, opened_speed_);
    line_.Report({.kind = LineEvent::Kind::kOpened,
                  .text = CommName(opened_port_) + " at " + std::to_string(opened_speed_) + " bit/s"});
    stage = "Setting RTS on";
    line_.SetRts(true);
    port_open_ = true;
  } catch (...) {
    const RuntimeError fault = CurrentFault();
    ClosePort();
    line_.Report({.kind = LineEvent::Kind::kOpenFailed, .text = fault.description()});
    throw RuntimeError(fault.number(), "Open of serial port " + port + " has failed\r\n\r\nError: (" +
                                           std::to_string(fault.number()) + ") " + fault.description() +
                                           "\r\nWhile: " + stage);
  }
  if (port_handler_) port_handler_(true);
}

void HwSerial::ClosePort(LineEvent::Kind why) noexcept {
  device_.Close();
  const bool was_open = std::exchange(port_open_, false);
  line_.OnClosed();
  if (was_open) line_.Report({.kind = why});
  if (was_open && port_handler_) port_handler_(false);
}

void HwSerial::OnDeviceEvent(SerialEvent event) {
  switch (event) {
    case SerialEvent::kDataReceived:
      return line_.OnDataReceived();
    case SerialEvent::kReceiveOverflow:
      return line_.DiscardInput();
    case SerialEvent::kDeviceLost:
      return ClosePort(LineEvent::Kind::kLost);
  }
}

void HwSerial::OnHeartbeatTimer() {
  if (!port_open_) return;
  try {
    XmitData(HeartbeatPacket());
  } catch (...) {
    return;  // it shows with the next command
  }
}

void HwSerial::SetRTS(bool asserted) {
  Traced("Trace: Let RTS", [&] {
    OpenPort();
    line_.SetRts(asserted);
  });
}

void HwSerial::RawOutput(std::span<const std::uint8_t> bytes) {
  if (bytes.empty()) return;
  Traced("Trace: In Rawoutput", [&] {
    OpenPort();
    XmitData(bytes);
  });
}

void HwSerial::RawOutput(std::u16string_view text) { RawOutput(AnsiBytes(text)); }

double HwSerial::SentByteCount(bool reset) {
  return reset ? std::exchange(sent_byte_count_, 0) : sent_byte_count_;
}

void HwSerial::SetPollPad(std::uint8_t pads) {
  poll_pad_ = std::clamp(pads, std::uint8_t{2}, std::uint8_t{200});
}

bool HwSerial::cmdPollStation(std::uint8_t unit, std::uint8_t kind) {
  if (unit == 0 || line_.PollOutstanding()) return false;
  OpenPort();
  if (!port_open_) throw RuntimeError(kErrPortNotOpen, "No serial port is open");
  line_.StartPoll(unit, kind, poll_pad_, opened_speed_);
  return true;
}

void HwSerial::OnPollEnd(HalfDuplexLine::PollResult result) {
  Bytes& data = result.data;
  bool success = result.replied;
  std::uint8_t code = result.kind;
  switch (result.kind) {
    case kKindDownload:
      downloads_[result.unit] = {.acknowledgement = success && data.size() > 2 ? data[2] : std::uint8_t{0},
                                 .timed_out = !success};
      return;
    case kKindBootloader:
      bootloader_ = {.data = success ? data : Bytes{}, .received = success, .timed_out = !success};
      if (success) line_.Trace([] { return std::string("Poll Data Received"); });
      return;
    case kKindStatus:
      success = success && result.code >= kFirstStatusCode && result.code <= kLastStatusCode;
      [[fallthrough]];
    case kKindReplyCode:
      if (success) code = result.code;
      break;
    default:
      break;
  }
  if (poll_reply_) poll_reply_(success, result.unit, code, data);
}

}  // namespace tendril
