#include "platform/qt/qt_serial_device.h"

#include <QSerialPortInfo>
#include <QString>
#include <QStringList>
#include <algorithm>
#include <charconv>
#include <string_view>
#include <utility>

#include "platform/port_names.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr char kSource[] = "SerialDevice";

// A driver that lets a device go without an error is found out this often.
constexpr int kDeadDeviceCheckMs = 1000;

// Everything but the speed in the only settings that are done.
constexpr std::string_view kNoParityEightOne = ",N,8,1";

std::string CommName(std::int32_t number) { return "Comm " + std::to_string(number); }

}  // namespace

QtSerialDevice::QtSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace)
    : on_fault_(std::move(on_fault)), trace_(std::move(trace)) {
  dead_device_check_.setInterval(kDeadDeviceCheckMs);
  QObject::connect(&dead_device_check_, &QTimer::timeout, &context_, [this] {
    if (hold_->DeviceGone()) NoteLoss();
  });
}

QtSerialDevice::~QtSerialDevice() { Close(); }

void QtSerialDevice::SetEventHandler(std::function<void(SerialEvent)> handler) {
  handler_ = std::move(handler);
}

bool QtSerialDevice::Exists(std::int32_t number) const { return FindSerialDevice(number).has_value(); }

std::string QtSerialDevice::Describe(std::int32_t number) const {
  const auto device = FindSerialDevice(number);
  if (!device) return {};
  const QSerialPortInfo info(QString::fromStdString(device->filename().string()));
  QStringList parts{info.description(), info.manufacturer(), QString::fromStdString(device->string())};
  parts.removeAll(QString());
  return parts.join(QStringLiteral(", ")).toStdString();
}

void QtSerialDevice::SetSettings(const std::string& settings) {
  const std::string_view text = settings;
  const std::string_view speed = text.substr(0, text.find(','));
  if (speed.empty()) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value", kSource);

  const RuntimeError refused(kErrSettingsRefused, "The serial port does not do \"" + settings + "\".",
                             kSource);
  std::int32_t baud_rate = 0;
  const auto [end, error] = std::from_chars(speed.data(), speed.data() + speed.size(), baud_rate);
  if (error != std::errc() || end != speed.data() + speed.size() || baud_rate <= 0) throw refused;
  if (text.substr(speed.size()) != kNoParityEightOne) throw refused;
  if (port_ && !loss_noted_ && !port_->setBaudRate(baud_rate) && !loss_noted_) throw refused;
  baud_rate_ = baud_rate;
}

void QtSerialDevice::SetPortNumber(std::int32_t number) {
  if (number < 1) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value", kSource);
  port_number_ = number;
}

void QtSerialDevice::SetLineOptions(const LineOptions& options) {
  if (options.handshaking || !options.binary_input || options.discard_nul ||
      options.transmit_threshold != 0 || options.input_buffer_size < 1 || options.receive_threshold < 0) {
    throw RuntimeError(kErrSettingsRefused, "The serial port does not do these line options.", kSource);
  }
  options_ = options;
  NoteWaiting();
}

void QtSerialDevice::Open() {
  if (port_) {
    throw RuntimeError(kErrPortAlreadyOpen, CommName(port_number_) + " is open already.", kSource);
  }
  const std::optional<std::filesystem::path> device = FindSerialDevice(port_number_);
  if (!device) {
    throw RuntimeError(kErrInvalidPort, "There is no serial device for " + CommName(port_number_) + ".",
                       kSource);
  }

  auto hold = std::make_unique<SerialHold>(*device);
  auto port = std::make_unique<QSerialPort>();
  OpenOrExplain(*port, *device);
  port->clear();  // what came before the port was open is not for us
  hold->AskForLowLatency();

  hold_ = std::move(hold);
  port_ = std::move(port);
  rts_missing_ = false;
  QObject::connect(port_.get(), &QSerialPort::readyRead, &context_, [this] { TakeArrived(); });
  QObject::connect(port_.get(), &QSerialPort::errorOccurred, &context_,
                   [this](QSerialPort::SerialPortError error) { OnError(error); });
  dead_device_check_.start();
}

void QtSerialDevice::OpenOrExplain(QSerialPort& port, const std::filesystem::path& device) const {
  port.setPortName(QString::fromStdString(device.string()));
  port.setBaudRate(baud_rate_);
  port.setDataBits(QSerialPort::Data8);
  port.setParity(QSerialPort::NoParity);
  port.setStopBits(QSerialPort::OneStop);
  port.setFlowControl(QSerialPort::NoFlowControl);
  if (port.open(QIODevice::ReadWrite)) return;

  const QSerialPort::SerialPortError error = port.error();
  const std::string name = device.string();
  if (error == QSerialPort::DeviceNotFoundError) {
    throw RuntimeError(kErrInvalidPort, "There is no serial device at " + name + ".", kSource);
  }
  // A person who is not allowed has been told by the claim, so this is somebody else's lock.
  if (error == QSerialPort::PermissionError || error == QSerialPort::OpenError) {
    throw RuntimeError(kErrPortAlreadyOpen, name + " is in use by another program.", kSource);
  }
  throw RuntimeError(kErrSettingsRefused,
                     name + " cannot be set to " + std::to_string(baud_rate_) +
                         " bit/s: " + port.errorString().toStdString() + ".",
                     kSource);
}

void QtSerialDevice::Close() noexcept {
  dead_device_check_.stop();
  if (port_) {
    port_->disconnect(&context_);
    // Otherwise the system goes on sending what is queued and keeps this call waiting for it.
    if (port_->isOpen()) port_->clear();
    port_.reset();
  }
  hold_.reset();
  input_.clear();
  data_noted_ = overflow_noted_ = loss_noted_ = false;
}

void QtSerialDevice::SetReceiveThreshold(std::int32_t bytes) {
  if (bytes < 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value", kSource);
  options_.receive_threshold = bytes;
  NoteWaiting();
}

void QtSerialDevice::SetTransmitThreshold(std::int32_t bytes) {
  if (bytes != 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value", kSource);
}

void QtSerialDevice::SetRts(bool asserted) {
  RequireOpen();
  if (loss_noted_ || port_->setRequestToSend(asserted)) return;
  if (port_->error() == QSerialPort::UnsupportedOperationError && !std::exchange(rts_missing_, true) &&
      trace_) {
    trace_(CommName(port_number_) + " has no RTS line; its adapter has to turn the line around by itself.");
  }
}

void QtSerialDevice::Write(std::span<const std::uint8_t> bytes) {
  RequireOpen();
  if (loss_noted_ || bytes.empty()) return;
  port_->write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
  port_->flush();  // otherwise sending starts when the event loop is idle
}

Bytes QtSerialDevice::ReadAll() {
  RequireOpen();
  // A device that never pauses is not run after: when the buffer is full, the rest waits in the system.
  const auto room = static_cast<std::size_t>(options_.input_buffer_size);
  while (!loss_noted_ && input_.size() < room && port_->waitForReadyRead(0)) {
  }
  return std::exchange(input_, {});
}

void QtSerialDevice::ClearInput() {
  RequireOpen();
  if (!loss_noted_) port_->clear(QSerialPort::Input);
  input_.clear();
}

std::size_t QtSerialDevice::PendingOutput() const {
  RequireOpen();
  if (loss_noted_) return 0;
  return static_cast<std::size_t>(port_->bytesToWrite()) + hold_->QueuedOutput();
}

void QtSerialDevice::RequireOpen() const {
  if (!port_) throw RuntimeError(kErrPortNotOpen, CommName(port_number_) + " is not open.", kSource);
}

void QtSerialDevice::TakeArrived() {
  const QByteArray arrived = port_->readAll();
  const auto capacity = static_cast<std::size_t>(options_.input_buffer_size);
  const std::size_t room = capacity - std::min(capacity, input_.size());
  const std::size_t kept = std::min(room, static_cast<std::size_t>(arrived.size()));
  input_.insert(input_.end(), arrived.begin(), arrived.begin() + static_cast<std::ptrdiff_t>(kept));

  if (kept < static_cast<std::size_t>(arrived.size())) {
    overflow_noted_ = true;
    PostDelivery();
  }
  NoteWaiting();
}

void QtSerialDevice::OnError(QSerialPort::SerialPortError error) {
  switch (error) {
    case QSerialPort::ReadError:
      // It is also told when ReadAll() was quicker than the event loop, which then finds nothing to read.
      if (hold_->DeviceGone()) NoteLoss();
      return;
    case QSerialPort::WriteError:
    case QSerialPort::ResourceError:
      NoteLoss();
      return;
    case QSerialPort::NoError:
    case QSerialPort::DeviceNotFoundError:
    case QSerialPort::PermissionError:
    case QSerialPort::OpenError:
    case QSerialPort::UnsupportedOperationError:
    case QSerialPort::UnknownError:
    case QSerialPort::TimeoutError:  // of reading what may be there
    case QSerialPort::NotOpenError:
      return;
  }
}

void QtSerialDevice::NoteLoss() {
  if (std::exchange(loss_noted_, true)) return;
  PostDelivery();
}

bool QtSerialDevice::EnoughWaits() const {
  const std::int32_t threshold = options_.receive_threshold;
  return threshold > 0 && input_.size() >= static_cast<std::size_t>(threshold);
}

void QtSerialDevice::NoteWaiting() {
  if (!EnoughWaits()) return;
  data_noted_ = true;
  PostDelivery();
}

void QtSerialDevice::PostDelivery() {
  if (std::exchange(delivery_posted_, true)) return;
  QMetaObject::invokeMethod(
      &context_, [this] { DeliverNext(); }, Qt::QueuedConnection);
}

std::optional<SerialEvent> QtSerialDevice::TakeNextEvent() {
  // What arrived may have been read since.
  if (std::exchange(data_noted_, false) && EnoughWaits()) return SerialEvent::kDataReceived;
  if (std::exchange(overflow_noted_, false)) return SerialEvent::kReceiveOverflow;
  if (loss_noted_) {
    Close();  // QSerialPort would go on telling of the dead device without end
    return SerialEvent::kDeviceLost;
  }
  return std::nullopt;
}

void QtSerialDevice::DeliverNext() {
  delivery_posted_ = false;
  const std::optional<SerialEvent> event = TakeNextEvent();
  if (data_noted_ || overflow_noted_ || loss_noted_) PostDelivery();
  if (!event || !handler_) return;

  // The handler may destroy this object: from here on only copies are used.
  const auto handler = handler_;
  const FaultHandler on_fault = on_fault_;
  CallGuarded(on_fault, [&] { handler(*event); });
}

}  // namespace tendril
