#include "ctl/port_opening.h"

#include <cstdint>

#include "platform/runtime_error.h"

namespace tendril::ctl {
namespace {

constexpr std::int32_t kNetworkBaudRate = 19200;

}  // namespace

std::optional<Report> PortOpening::Open() {
  try {
    link_.SetCommPort(line_.port);
    link_.SetBaudRate(kNetworkBaudRate);
    link_.SetPortOpen(true);
    link_.SetRTS(true);
  } catch (...) {
    return Report{.exit_code = kExitPort, .problem = QString::fromStdString(DescribeCurrentFault())};
  }
  return std::nullopt;
}

void PortOpening::GiveBack() { link_.SetCommPort(0); }

}  // namespace tendril::ctl
