#include <QWinEventNotifier>
#include <functional>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/system_serial_port.h"
#include "platform/windows/serial_handle.h"

namespace tendril {
namespace {

// Reports an event while it is set. The emulator may report one that has just been switched off: such a report must find
// the notifier, so it is destroyed by the event loop.
class Notifier {
 public:
  explicit Notifier(void* event) { notifier_->setHandle(event); }
  ~Notifier() {
    notifier_->disconnect();
    notifier_->setEnabled(false);
    notifier_->deleteLater();
  }
  Notifier(const Notifier&) = delete;
  Notifier& operator=(const Notifier&) = delete;

  void Call(std::function<void()> on_set) {
    QObject::connect(notifier_, &QWinEventNotifier::activated, notifier_, std::move(on_set));
  }
  void SetEnabled(bool enabled) { notifier_->setEnabled(enabled); }

 private:
  QWinEventNotifier* notifier_ = new QWinEventNotifier;
};

class WindowsSerialPort final : public SerialHandle {
 public:
  WindowsSerialPort(const std::filesystem::path& device, std::int32_t baud, std::function<void()> on_readable,
                    std::function<void()> on_writable)
      : SerialHandle(device, baud) {
    arrived_.Call([this, on_readable = std::move(on_readable)] {
      on_readable();
      if (lost()) arrived_.SetEnabled(false);  // the event of a lost device stays set
    });
    written_.Call(std::move(on_writable));
    arrived_.SetEnabled(true);
  }

  void NotifyWritable(bool enabled) override { written_.SetEnabled(enabled); }

 private:
  Notifier arrived_{arrived()};
  Notifier written_{written()};
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
