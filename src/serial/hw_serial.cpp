#include "serial/hw_serial.h"

#include <algorithm>
#include <utility>

#include "platform/ansi_text.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int32_t kHeartbeatPeriodMs = 500;

// The only speeds that give a valid settings text.
std::string SpeedText(std::int32_t baud) {
  switch (baud) {
    case 19200:
    case 56000:
    case 115200:
    case 500000:
    case 750000:
    case 1000000:
      return std::to_string(baud);
    default:
      return {};
  }
}

}  // namespace

HwSerial::HwSerial(SerialDevice& device, TimerFactory& timers, Clock& clock, CommandLog& log)
    : device_(device),
      clock_(clock),
      log_(log),
      poll_timer_(timers.CreateTimer([this] { OnPollTimer(); })),
      heartbeat_timer_(timers.CreateTimer([this] { OnHeartbeatTimer(); })),
      timer_period_ms_(clock.RequestFinestTimerPeriod()),
      tick_granularity_ms_(clock.GranularityMs()) {
  heartbeat_timer_->SetInterval(kHeartbeatPeriodMs);
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
    const std::string settings = SpeedText(baud_rate_) + ",N,8,1";
    opened_speed_ = baud_rate_;
    stage = "Setting(" + settings + ")";
    if (settings.starts_with(',')) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
    stage = "Setting Port = " + port;
    if (comm_port_ < 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
    opened_port_ = comm_port_;
    stage = "Setting misc Comm Settings";
    device_.SetReceiveThreshold(kIdleReceiveThreshold);
    stage = "Executing Port Open Property";
    device_.Open(opened_port_, opened_speed_);
    stage = "Setting RTS on";
    device_.SetRts(true);
    line_released_ = false;
    port_open_ = true;
  } catch (...) {
    const RuntimeError fault = CurrentFault();
    ClosePort();
    throw RuntimeError(fault.number(), "Open of serial port " + port + " has failed\r\n\r\nError: (" +
                                           std::to_string(fault.number()) + ") " + fault.description() +
                                           "\r\nWhile: " + stage);
  }
}

void HwSerial::ClosePort() noexcept {
  device_.Close();
  const bool was_open = std::exchange(port_open_, false);
  held_back_.assign(1, 0);
  if (poll_) poll_->line_closed = true;
  if (was_open && port_closed_) port_closed_();
}

void HwSerial::SetRTS(bool asserted) {
  Traced("Trace: Let RTS", [&] {
    OpenPort();
    device_.SetRts(asserted);
    line_released_ = false;  // the line is as the host wants it
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

}  // namespace tendril
