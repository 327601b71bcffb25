#include "platform/qt/windows_serial_device.h"

#include <QSerialPortInfo>
#include <QString>
#include <QStringList>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/system_serial_device.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

// A driver that lets a device go without a word is noticed within this time.
constexpr int kDeadDeviceCheckMs = 1000;

// As on the other systems.
constexpr std::size_t kMaxWaitingOutput = std::size_t{64} * 1024;

// Raises why `port` could not be opened, in the words of a user.
[[noreturn]] void Explain(const QSerialPort& port, std::int32_t number) {
  const QSerialPort::SerialPortError error = port.error();
  if (error == QSerialPort::DeviceNotFoundError) {
    throw RuntimeError(kErrInvalidPort, "There is no serial device for " + CommName(number) + ".");
  }
  if (error == QSerialPort::PermissionError || error == QSerialPort::OpenError) {
    throw RuntimeError(kErrPortAlreadyOpen, CommName(number) + " is in use by another program.");
  }
  throw RuntimeError(kErrSettingsRefused,
                     CommName(number) + " cannot be set up: " + port.errorString().toStdString() + ".");
}

}  // namespace

WindowsSerialDevice::WindowsSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace)
    : inbox_(std::move(on_fault), [this] { Close(); }), trace_(std::move(trace)) {
  dead_device_check_.setInterval(kDeadDeviceCheckMs);
  QObject::connect(&dead_device_check_, &QTimer::timeout, &dead_device_check_, [this] { CheckForLoss(); });
}

WindowsSerialDevice::~WindowsSerialDevice() { Close(); }

void WindowsSerialDevice::SetEventHandler(std::function<void(SerialEvent)> handler) {
  inbox_.SetEventHandler(std::move(handler));
}

bool WindowsSerialDevice::Exists(std::int32_t number) const { return FindSerialDevice(number).has_value(); }

std::string WindowsSerialDevice::Describe(std::int32_t number) const {
  const auto device = FindSerialDevice(number);
  if (!device) return {};
  const QSerialPortInfo info(QString::fromStdString(device->filename().string()));
  QStringList parts{info.description(), info.manufacturer(), QString::fromStdString(device->string())};
  parts.removeAll(QString());
  return parts.join(QStringLiteral(", ")).toStdString();
}

void WindowsSerialDevice::Open(std::int32_t number, std::int32_t baud) {
  if (port_) throw RuntimeError(kErrPortAlreadyOpen, CommName(number_) + " is open already.");
  const auto device = FindSerialDevice(number);
  if (!device) {
    throw RuntimeError(kErrInvalidPort, "There is no serial device for " + CommName(number) + ".");
  }
  auto port = std::make_unique<QSerialPort>();
  port->setPortName(QString::fromStdString(device->string()));
  port->setBaudRate(baud);
  port->setDataBits(QSerialPort::Data8);
  port->setParity(QSerialPort::NoParity);
  port->setStopBits(QSerialPort::OneStop);
  port->setFlowControl(QSerialPort::NoFlowControl);
  if (!port->open(QIODevice::ReadWrite)) Explain(*port, number);
  port->clear();  // what came before the port was open is not for us

  port_ = std::move(port);
  number_ = number;
  rts_traced_ = false;
  QObject::connect(port_.get(), &QSerialPort::readyRead, port_.get(), [this] { TakeArrived(); });
  // QSerialPort takes faults for a loss that are none.
  QObject::connect(port_.get(), &QSerialPort::errorOccurred, port_.get(), [this] { CheckForLoss(); });
  dead_device_check_.start();
}

void WindowsSerialDevice::Close() noexcept {
  dead_device_check_.stop();
  if (port_) {
    port_->disconnect();
    if (port_->isOpen()) port_->clear();  // what is queued is not sent any more
    port_.reset();
  }
  inbox_.Reset();
}

void WindowsSerialDevice::SetReceiveThreshold(std::int32_t bytes) { inbox_.SetReceiveThreshold(bytes); }

void WindowsSerialDevice::SetRts(bool asserted) {
  QSerialPort& port = OpenPort();
  if (inbox_.LossPosted() || port.setRequestToSend(asserted)) return;
  CheckForLoss();
  if (inbox_.LossPosted()) return;
  if (port.error() == QSerialPort::UnsupportedOperationError) {
    TraceRts(CommName(number_) + " has no RTS line; its adapter has to turn the line around by itself.");
    return;
  }
  const RuntimeError fault(kErrDeviceIo, "RTS of " + CommName(number_) + " cannot be " +
                                             (asserted ? "asserted" : "cleared") + ": " +
                                             port.errorString().toStdString() + ".");
  TraceRts(fault.description());
  throw fault;
}

void WindowsSerialDevice::Write(std::span<const std::uint8_t> bytes) {
  QSerialPort& port = OpenPort();
  if (inbox_.LossPosted() || bytes.empty()) return;
  if (static_cast<std::size_t>(port.bytesToWrite()) + bytes.size() > kMaxWaitingOutput) {
    throw RuntimeError(kErrDeviceIo, CommName(number_) + " takes nothing.");
  }
  port.write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
  port.flush();  // otherwise sending starts when the event loop is idle
}

Bytes WindowsSerialDevice::ReadAll() {
  QSerialPort& port = OpenPort();
  while (!inbox_.LossPosted() && inbox_.Room() > 0 && port.waitForReadyRead(0)) {
  }
  return inbox_.Take();
}

void WindowsSerialDevice::ClearInput() {
  QSerialPort& port = OpenPort();
  if (!inbox_.LossPosted()) port.clear(QSerialPort::Input);
  inbox_.Take();
}

// A write counts as pending in the port itself until the driver has sent it.
std::size_t WindowsSerialDevice::PendingOutput() const {
  const QSerialPort& port = OpenPort();
  return inbox_.LossPosted() ? 0 : static_cast<std::size_t>(port.bytesToWrite());
}

QSerialPort& WindowsSerialDevice::OpenPort() const {
  if (!port_) throw RuntimeError(kErrPortNotOpen, "No serial port is open.");
  return *port_;
}

void WindowsSerialDevice::TakeArrived() {
  const QByteArray arrived = port_->readAll();
  inbox_.Add(
      {reinterpret_cast<const std::uint8_t*>(arrived.data()), static_cast<std::size_t>(arrived.size())});
}

void WindowsSerialDevice::CheckForLoss() {
  if (inbox_.LossPosted() || FindSerialDevice(number_)) return;
  dead_device_check_.stop();
  inbox_.PostLoss();
}

void WindowsSerialDevice::TraceRts(const std::string& line) {
  if (!std::exchange(rts_traced_, true) && trace_) trace_(line);
}

std::unique_ptr<SerialDevice> CreateSystemSerialDevice(FaultHandler on_fault,
                                                       std::function<void(const std::string&)> trace) {
  return std::make_unique<WindowsSerialDevice>(std::move(on_fault), std::move(trace));
}

}  // namespace tendril
