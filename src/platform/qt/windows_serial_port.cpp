#include <QSerialPort>
#include <QSerialPortInfo>
#include <QSignalBlocker>
#include <QString>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/system_serial_port.h"
#include "platform/runtime_error.h"
#include "platform/serial_device.h"

namespace tendril {
namespace {

// Bytes that the port's own queue takes; the rest waits at the owner.
constexpr qint64 kMaxQueuedOutput = qint64{64} * 1024;

// Windows opens every serial port for one program alone, and takes a port's name away with its device, even while the
// port is open.
class WindowsSerialPort final : public SerialPort {
 public:
  WindowsSerialPort(std::int32_t number, const std::filesystem::path& device, std::int32_t baud,
                    std::function<void()> on_readable, std::function<void()> on_writable)
      : number_(number) {
    port_.setPortName(QString::fromStdString(device.string()));
    port_.setBaudRate(baud);
    port_.setDataBits(QSerialPort::Data8);
    port_.setParity(QSerialPort::NoParity);
    port_.setStopBits(QSerialPort::OneStop);
    port_.setFlowControl(QSerialPort::NoFlowControl);
    if (!port_.open(QIODevice::ReadWrite)) RaiseWhyNotOpen();
    port_.clear();  // what arrived before
    QObject::connect(&port_, &QSerialPort::readyRead, &port_, [this, on_readable] {
      for (qint64 before = 0; before != port_.bytesAvailable();) {  // as long as it reads
        before = port_.bytesAvailable();
        on_readable();
      }
    });
    // An error may be a loss, or none: QSerialPort does not distinguish them.
    QObject::connect(&port_, &QSerialPort::errorOccurred, &port_, std::move(on_readable),
                     Qt::QueuedConnection);
    QObject::connect(&port_, &QSerialPort::bytesWritten, &port_,
                     [this, on_writable = std::move(on_writable)] {
                       if (notify_writable_) on_writable();
                     });
  }
  ~WindowsSerialPort() override {
    port_.disconnect();
    if (port_.isOpen()) port_.clear();  // what is queued is not sent any more
  }

  std::size_t Read(std::span<std::uint8_t> buffer) override {
    if (port_.bytesAvailable() == 0) {
      const QSignalBlocker quiet(port_);
      port_.waitForReadyRead(0);
    }
    const qint64 got = port_.read(reinterpret_cast<char*>(buffer.data()), static_cast<qint64>(buffer.size()));
    return got > 0 ? static_cast<std::size_t>(got) : 0;
  }
  std::size_t Write(std::span<const std::uint8_t> bytes) override {
    if (bytes.empty() || port_.bytesToWrite() >= kMaxQueuedOutput) return 0;
    port_.write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
    port_.flush();  // otherwise sending starts when the event loop is idle
    return bytes.size();
  }
  void NotifyWritable(bool enabled) override { notify_writable_ = enabled; }
  std::size_t QueuedOutput() const override { return static_cast<std::size_t>(port_.bytesToWrite()); }
  void ClearInput() override { port_.clear(QSerialPort::Input); }
  bool SetRts(bool asserted) override {
    if (port_.setRequestToSend(asserted)) return true;
    if (port_.error() == QSerialPort::UnsupportedOperationError) return false;
    throw RuntimeError(kErrDeviceIo, "RTS of " + CommName(number_) + " cannot be " +
                                         (asserted ? "asserted" : "cleared") + ": " +
                                         port_.errorString().toStdString() + ".");
  }
  bool HungUp() const override { return !FindSerialDevice(number_); }

 private:
  [[noreturn]] void RaiseWhyNotOpen() const {
    const std::string name = CommName(number_);
    const QSerialPort::SerialPortError error = port_.error();
    if (error == QSerialPort::DeviceNotFoundError) {
      throw RuntimeError(kErrInvalidPort, "There is no serial device for " + name + ".");
    }
    if (error == QSerialPort::PermissionError || error == QSerialPort::OpenError) {
      throw RuntimeError(kErrPortAlreadyOpen, name + " is in use by another program.");
    }
    throw RuntimeError(kErrSettingsRefused,
                       name + " cannot be set up: " + port_.errorString().toStdString() + ".");
  }

  const std::int32_t number_;
  QSerialPort port_;
  bool notify_writable_ = false;
};

}  // namespace

std::unique_ptr<SerialPort> OpenSerialPort(std::int32_t number, const std::filesystem::path& device,
                                           std::int32_t baud, std::function<void()> on_readable,
                                           std::function<void()> on_writable) {
  return std::make_unique<WindowsSerialPort>(number, device, baud, std::move(on_readable),
                                             std::move(on_writable));
}

DeviceDescription DescribeSerialPort(const std::filesystem::path& device) {
  const QSerialPortInfo info(QString::fromStdString(device.filename().string()));
  return {info.description().toStdString(), info.manufacturer().toStdString(), device.string()};
}

// An ordinary user's program cannot find out.
PortHolder FindSerialPortHolder(const std::filesystem::path& /*device*/) { return {}; }

}  // namespace tendril
