#include <QSocketNotifier>
#include <utility>

#include "platform/port_names.h"
#include "platform/posix/port_holder.h"
#include "platform/posix/serial_terminal.h"
#include "platform/qt/system_serial_port.h"

namespace tendril {
namespace {

class PosixSerialPort final : public SerialTerminal {
 public:
  PosixSerialPort(const std::filesystem::path& device, std::int32_t baud, std::function<void()> on_readable,
                  std::function<void()> on_writable)
      : SerialTerminal(device, baud),
        readable_(descriptor(), QSocketNotifier::Read),
        writable_(descriptor(), QSocketNotifier::Write) {
    writable_.setEnabled(false);
    QObject::connect(&readable_, &QSocketNotifier::activated, &readable_, std::move(on_readable));
    QObject::connect(&writable_, &QSocketNotifier::activated, &writable_, std::move(on_writable));
  }

  void NotifyWritable(bool enabled) override { writable_.setEnabled(enabled); }

 private:
  QSocketNotifier readable_;
  QSocketNotifier writable_;
};

}  // namespace

std::unique_ptr<SerialPort> OpenSerialPort(std::int32_t /*number*/, const std::filesystem::path& device,
                                           std::int32_t baud, std::function<void()> on_readable,
                                           std::function<void()> on_writable) {
  return std::make_unique<PosixSerialPort>(device, baud, std::move(on_readable), std::move(on_writable));
}

DeviceDescription DescribeSerialPort(const std::filesystem::path& device) {
  return DescribeSerialDevice(device);
}

PortHolder FindSerialPortHolder(const std::filesystem::path& device) { return FindPortHolder(device); }

}  // namespace tendril
