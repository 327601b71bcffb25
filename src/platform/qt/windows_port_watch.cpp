#include <windows.h>

#include <QAbstractNativeEventFilter>
#include <QCoreApplication>
#include <utility>

#include "platform/qt/port_watch.h"

namespace tendril {

// Windows notifies every window of the program when a port comes or goes.
struct PortWatch::Reports final : QAbstractNativeEventFilter {
  explicit Reports(PortWatch& owner) : watch(owner) {}

  bool nativeEventFilter(const QByteArray& /*type*/, void* message, qintptr* /*result*/) override {
    if (static_cast<const MSG*>(message)->message == WM_DEVICECHANGE) watch.Noticed();
    return false;
  }

  PortWatch& watch;
};

PortWatch::PortWatch(std::function<void()> on_change) : reports_(std::make_unique<Reports>(*this)) {
  CallWhenSettled(std::move(on_change));
  QCoreApplication::instance()->installNativeEventFilter(reports_.get());
}

PortWatch::~PortWatch() = default;  // a filter that is destroyed removes itself

}  // namespace tendril
