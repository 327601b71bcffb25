#include "platform/qt/posix_serial_device.h"

#include <algorithm>
#include <array>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/system_serial_device.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

// A driver that lets a device go without a word is noticed within this time.
constexpr int kDeadDeviceCheckMs = 1000;

// What a device may leave waiting, in bytes, before it counts as stuck: half a minute of the slowest line.
constexpr std::size_t kMaxWaitingOutput = std::size_t{64} * 1024;

// Bytes that are taken out of the system at once.
constexpr std::size_t kPieceBytes = 4096;

}  // namespace

PosixSerialDevice::Port::Port(const std::filesystem::path& device, std::int32_t baud)
    : terminal(device, baud),
      readable(terminal.descriptor(), QSocketNotifier::Read),
      writable(terminal.descriptor(), QSocketNotifier::Write) {
  writable.setEnabled(false);
}

PosixSerialDevice::PosixSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace)
    : inbox_(std::move(on_fault), [this] { Close(); }), trace_(std::move(trace)) {
  dead_device_check_.setInterval(kDeadDeviceCheckMs);
  QObject::connect(&dead_device_check_, &QTimer::timeout, &dead_device_check_, [this] { CheckForLoss(); });
}

PosixSerialDevice::~PosixSerialDevice() { Close(); }

void PosixSerialDevice::SetEventHandler(std::function<void(SerialEvent)> handler) {
  inbox_.SetEventHandler(std::move(handler));
}

bool PosixSerialDevice::Exists(std::int32_t number) const { return FindSerialDevice(number).has_value(); }

std::string PosixSerialDevice::Describe(std::int32_t number) const {
  const auto device = FindSerialDevice(number);
  return device ? DescribeSerialDevice(*device) : std::string();
}

void PosixSerialDevice::Open(std::int32_t number, std::int32_t baud) {
  if (port_) throw RuntimeError(kErrPortAlreadyOpen, CommName(number_) + " is open already.");
  const auto device = FindSerialDevice(number);
  if (!device) {
    throw RuntimeError(kErrInvalidPort, "There is no serial device for " + CommName(number) + ".");
  }
  port_ = std::make_unique<Port>(*device, baud);
  number_ = number;
  rts_traced_ = false;
  QObject::connect(&port_->readable, &QSocketNotifier::activated, &port_->readable,
                   [this] { Receive(kPieceBytes); });
  QObject::connect(&port_->writable, &QSocketNotifier::activated, &port_->writable, [this] {
    try {
      SendWaiting();
    } catch (const RuntimeError& fault) {
      if (trace_) trace_(fault.description());
    }
  });
  dead_device_check_.start();
}

void PosixSerialDevice::Close() noexcept {
  dead_device_check_.stop();
  port_.reset();
  inbox_.Reset();
}

void PosixSerialDevice::SetReceiveThreshold(std::int32_t bytes) { inbox_.SetReceiveThreshold(bytes); }

void PosixSerialDevice::SetRts(bool asserted) {
  Port& port = OpenPort();
  if (inbox_.LossPosted()) return;
  try {
    if (!port.terminal.SetRts(asserted)) {
      TraceRts(CommName(number_) + " has no RTS line; its adapter has to turn the line around by itself.");
    }
  } catch (const RuntimeError& fault) {
    CheckForLoss();
    if (inbox_.LossPosted()) return;
    TraceRts(fault.description());
    throw;
  }
}

void PosixSerialDevice::Write(std::span<const std::uint8_t> bytes) {
  Port& port = OpenPort();
  if (inbox_.LossPosted()) return;
  if (port.output.size() + bytes.size() > kMaxWaitingOutput) {
    throw RuntimeError(kErrDeviceIo, CommName(number_) + " takes nothing: " +
                                         std::to_string(port.output.size()) + " bytes wait to be sent.");
  }
  port.output.insert(port.output.end(), bytes.begin(), bytes.end());
  SendWaiting();
}

Bytes PosixSerialDevice::ReadAll() {
  OpenPort();
  // A device that never pauses is not run after: when the buffer is full, the rest waits in the system.
  while (inbox_.Room() > 0 && Receive(inbox_.Room())) {
  }
  return inbox_.Take();
}

void PosixSerialDevice::ClearInput() {
  OpenPort().terminal.ClearInput();
  inbox_.Take();
}

std::size_t PosixSerialDevice::PendingOutput() const {
  const Port& port = OpenPort();
  return inbox_.LossPosted() ? 0 : port.output.size() + port.terminal.QueuedOutput();
}

PosixSerialDevice::Port& PosixSerialDevice::OpenPort() const {
  if (!port_) throw RuntimeError(kErrPortNotOpen, "No serial port is open.");
  return *port_;
}

bool PosixSerialDevice::Receive(std::size_t limit) {
  if (inbox_.LossPosted()) return false;
  std::array<std::uint8_t, kPieceBytes> piece;
  const std::size_t got = port_->terminal.Read(std::span(piece).first(std::min(limit, piece.size())));
  if (got == 0) {
    CheckForLoss();
    return false;
  }
  inbox_.Add(std::span(piece).first(got));
  return true;
}

// Hands over what the system takes now; the notifier hands over the rest.
void PosixSerialDevice::SendWaiting() {
  Bytes& output = port_->output;
  try {
    const std::size_t taken = port_->terminal.Write(output);
    output.erase(output.begin(), output.begin() + static_cast<std::ptrdiff_t>(taken));
  } catch (const RuntimeError&) {
    output.clear();
    port_->writable.setEnabled(false);
    CheckForLoss();
    if (!inbox_.LossPosted()) throw;
  }
  port_->writable.setEnabled(!output.empty());
}

// A dead device stays readable, but not for long: the delivery of the loss closes it.
void PosixSerialDevice::CheckForLoss() {
  if (port_->terminal.HungUp()) inbox_.PostLoss();
}

void PosixSerialDevice::TraceRts(const std::string& line) {
  if (!std::exchange(rts_traced_, true) && trace_) trace_(line);
}

std::unique_ptr<SerialDevice> CreateSystemSerialDevice(FaultHandler on_fault,
                                                       std::function<void(const std::string&)> trace) {
  return std::make_unique<PosixSerialDevice>(std::move(on_fault), std::move(trace));
}

}  // namespace tendril
