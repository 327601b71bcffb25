#include "platform/qt/qt_serial_device.h"

#include <algorithm>
#include <array>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/system_serial_port.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

// Finds a device that goes away without a report by its driver.
constexpr int kDeadDeviceCheckMs = 1000;

// What a device may leave waiting, in bytes, before it counts as stuck: half a minute of the slowest line.
constexpr std::size_t kMaxWaitingOutput = std::size_t{64} * 1024;

// Bytes that are taken out of the system at once.
constexpr std::size_t kPieceBytes = 4096;

}  // namespace

QtSerialDevice::QtSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace)
    : trace_(std::move(trace)), mailbox_(on_fault), on_fault_(std::move(on_fault)) {
  dead_device_check_.setInterval(kDeadDeviceCheckMs);
  QObject::connect(&dead_device_check_, &QTimer::timeout, &dead_device_check_, [this] { CheckForLoss(); });
}

QtSerialDevice::~QtSerialDevice() { Close(); }

void QtSerialDevice::SetEventHandler(std::function<void(SerialEvent)> handler) {
  handler_ = std::move(handler);
}

bool QtSerialDevice::Exists(std::int32_t number) const { return FindSerialDevice(number).has_value(); }

DeviceDescription QtSerialDevice::Describe(std::int32_t number) const {
  const auto device = FindSerialDevice(number);
  return device ? DescribeSerialPort(*device) : DeviceDescription();
}

PortHolder QtSerialDevice::Holder(std::int32_t number) const {
  const auto device = FindSerialDevice(number);
  return device ? FindSerialPortHolder(*device) : PortHolder();
}

void QtSerialDevice::WatchPorts(const std::function<void()>& handler) {
  watch_.reset();
  if (!handler) return;
  watch_ = std::make_unique<PortWatch>([on_fault = on_fault_, handler] { CallGuarded(on_fault, handler); });
}

void QtSerialDevice::Open(std::int32_t number, std::int32_t baud) {
  if (port_) throw RuntimeError(kErrPortAlreadyOpen, CommName(number_) + " is open already.");
  const auto device = FindSerialDevice(number);
  if (!device) throw RuntimeError(kErrInvalidPort, "There is no serial device for " + CommName(number) + ".");
  port_ = OpenSerialPort(
      number, *device, baud, [this] { Receive(kPieceBytes); },
      [this] {
        try {
          SendWaiting();
        } catch (const RuntimeError& fault) {
          if (trace_) trace_(fault.description());
        }
      });
  number_ = number;
  rts_traced_ = false;
  dead_device_check_.start();
}

void QtSerialDevice::Close() noexcept {
  dead_device_check_.stop();
  port_.reset();
  input_.clear();
  output_.clear();
  data_posted_ = overflow_posted_ = loss_posted_ = false;
  mailbox_.Clear();
}

void QtSerialDevice::SetReceiveThreshold(std::int32_t bytes) {
  if (bytes < 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
  receive_threshold_ = bytes;
  PostIfEnough();
}

void QtSerialDevice::SetRts(bool asserted) {
  SerialPort& port = OpenPort();
  if (loss_posted_) return;
  try {
    if (!port.SetRts(asserted)) {
      TraceRts(CommName(number_) + " has no RTS line; its adapter has to turn the line around by itself.");
    }
  } catch (const RuntimeError& fault) {
    CheckForLoss();
    if (loss_posted_) return;
    TraceRts(fault.description());
    throw;
  }
}

void QtSerialDevice::Write(std::span<const std::uint8_t> bytes) {
  OpenPort();
  if (loss_posted_) return;
  if (output_.size() + bytes.size() > kMaxWaitingOutput) {
    throw RuntimeError(kErrDeviceIo, CommName(number_) + " takes nothing: " + std::to_string(output_.size()) +
                                         " bytes wait to be sent.");
  }
  output_.insert(output_.end(), bytes.begin(), bytes.end());
  SendWaiting();
}

Bytes QtSerialDevice::ReadAll() {
  OpenPort();
  // Not for ever, when a device never pauses: once the buffer is full, the rest waits in the system.
  while (Room() > 0 && Receive(Room())) {
  }
  return std::exchange(input_, {});
}

void QtSerialDevice::ClearInput() {
  OpenPort().ClearInput();
  input_.clear();
}

std::size_t QtSerialDevice::PendingOutput() const {
  const SerialPort& port = OpenPort();
  return loss_posted_ ? 0 : output_.size() + port.QueuedOutput();
}

SerialPort& QtSerialDevice::OpenPort() const {
  if (!port_) throw RuntimeError(kErrPortNotOpen, "No serial port is open.");
  return *port_;
}

bool QtSerialDevice::Receive(std::size_t limit) {
  if (loss_posted_) return false;
  std::array<std::uint8_t, kPieceBytes> piece;
  const std::size_t got = port_->Read(std::span(piece).first(std::min(limit, piece.size())));
  if (got == 0) {
    CheckForLoss();
    return false;
  }
  const std::size_t kept = std::min(Room(), got);
  input_.insert(input_.end(), piece.begin(), piece.begin() + static_cast<std::ptrdiff_t>(kept));
  PostIfEnough();
  if (kept < got && !std::exchange(overflow_posted_, true)) {
    mailbox_.Post([this] {
      overflow_posted_ = false;
      Deliver(SerialEvent::kReceiveOverflow);
    });
  }
  return true;
}

// Hands over what the system takes now; the rest follows when it takes more.
void QtSerialDevice::SendWaiting() {
  try {
    const std::size_t taken = port_->Write(output_);
    output_.erase(output_.begin(), output_.begin() + static_cast<std::ptrdiff_t>(taken));
  } catch (const RuntimeError&) {
    output_.clear();
    port_->NotifyWritable(false);
    CheckForLoss();
    if (!loss_posted_) throw;
  }
  port_->NotifyWritable(!output_.empty());
}

// A lost device stays readable, but not for long: the delivery of the loss closes the port.
void QtSerialDevice::CheckForLoss() {
  if (!port_->HungUp() || std::exchange(loss_posted_, true)) return;
  mailbox_.Post([this] {
    Close();
    Deliver(SerialEvent::kDeviceLost);
  });
}

// The first time after the port was opened.
void QtSerialDevice::TraceRts(const std::string& line) {
  if (!std::exchange(rts_traced_, true) && trace_) trace_(line);
}

bool QtSerialDevice::HasEnough() const {
  return receive_threshold_ > 0 && input_.size() >= static_cast<std::size_t>(receive_threshold_);
}

void QtSerialDevice::PostIfEnough() {
  if (!HasEnough() || std::exchange(data_posted_, true)) return;
  mailbox_.Post([this] {
    data_posted_ = false;
    if (HasEnough()) Deliver(SerialEvent::kDataReceived);  // what arrived may have been read since
  });
}

void QtSerialDevice::Deliver(SerialEvent event) {
  const auto handler = handler_;  // which may destroy this object
  if (handler) handler(event);
}

}  // namespace tendril
