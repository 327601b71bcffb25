#include "platform/qt/fault_handler.h"

#include <QtDebug>

#include "platform/runtime_error.h"

namespace tendril {

void ReportFault(const FaultHandler& on_fault, const std::string& description) noexcept {
  try {
    if (on_fault) return on_fault(description);
  } catch (...) {
    qCritical("The following failure could not be shown.");
  }
  qCritical("%s", description.c_str());
}

void CallGuarded(const FaultHandler& on_fault, const std::function<void()>& call) noexcept {
  try {
    call();
  } catch (...) {
    ReportFault(on_fault, DescribeCurrentFault());
  }
}

}  // namespace tendril
