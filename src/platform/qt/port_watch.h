// PortWatch: notices that serial devices may have come or gone.
#pragma once

#include <QTimer>
#include <functional>
#include <memory>

namespace tendril {

// Waits for the system's reports; it does not look by itself. Each system compiles its own implementation.
class PortWatch {
 public:
  // `on_change` is called from the event loop a second after the first report of a burst: not more often than that, and
  // late enough for the system to have set up the device's links and permissions.
  explicit PortWatch(std::function<void()> on_change);
  ~PortWatch();
  PortWatch(const PortWatch&) = delete;
  PortWatch& operator=(const PortWatch&) = delete;

 private:
  struct Reports;  // of the system

  // There was a report.
  void Noticed() {
    if (!settling_.isActive()) settling_.start();
  }
  void CallWhenSettled(std::function<void()> on_change) {
    constexpr int kSettleMs = 1000;
    settling_.setSingleShot(true);
    settling_.setInterval(kSettleMs);
    QObject::connect(&settling_, &QTimer::timeout, &settling_, std::move(on_change));
  }

  QTimer settling_;
  std::unique_ptr<Reports> reports_;
};

}  // namespace tendril
