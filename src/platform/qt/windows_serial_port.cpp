#include <QWinEventNotifier>
#include <functional>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/system_serial_port.h"
#include "platform/windows/serial_handle.h"

namespace tendril {
namespace {

class WindowsSerialPort final : public SerialHandle {
 public:
  WindowsSerialPort(const std::filesystem::path& device, std::int32_t baud, std::function<void()> on_readable,
                    std::function<void()> on_writable)
      : SerialHandle(device, baud), arrived_(arrived()), read_(read()) {
    written_.setHandle(written());  // which does not enable it: the event is set
    const auto notified = [this, on_readable = std::move(on_readable)] {
      on_readable();
      // The events of a lost device stay set.
      for (QWinEventNotifier* notifier : {&arrived_, &read_}) notifier->setEnabled(!lost());
    };
    QObject::connect(&arrived_, &QWinEventNotifier::activated, &arrived_, notified);
    QObject::connect(&read_, &QWinEventNotifier::activated, &read_, notified);
    QObject::connect(&written_, &QWinEventNotifier::activated, &written_, std::move(on_writable));
  }

  void NotifyWritable(bool enabled) override { written_.setEnabled(enabled); }

 private:
  QWinEventNotifier arrived_;
  QWinEventNotifier read_;
  QWinEventNotifier written_;
};

}  // namespace

std::unique_ptr<SerialPort> OpenSerialPort(std::int32_t /*number*/, const std::filesystem::path& device,
                                           std::int32_t baud, std::function<void()> on_readable,
                                           std::function<void()> on_writable) {
  return std::make_unique<WindowsSerialPort>(device, baud, std::move(on_readable), std::move(on_writable));
}

DeviceDescription DescribeSerialPort(const std::filesystem::path& device) {
  return DescribeSerialDevice(device);
}

// An ordinary user's program cannot find out.
PortHolder FindSerialPortHolder(const std::filesystem::path& /*device*/) { return {}; }

}  // namespace tendril
