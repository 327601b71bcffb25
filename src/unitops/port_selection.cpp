#include "unitops/port_selection.h"

#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int16_t kLastListedPort = 25;
constexpr std::int32_t kNetworkBaudRate = 19200;

}  // namespace

PortSelection::PortSelection(HwSerial& link, MessageBoxes& boxes) : link_(link), boxes_(boxes) {}

std::vector<std::string> PortSelection::ListCommPorts() {
  port_table_ = {0};
  std::vector<std::string> lines{"Select"};
  for (std::int16_t number = 1; number <= kLastListedPort; ++number) {
    if (!link_.ComPortExists(number)) continue;
    port_table_.push_back(number);
    lines.push_back("Comm " + std::to_string(number));
  }
  return lines;
}

void PortSelection::Choose(std::size_t entry) {
  if (entry == 0 || entry >= port_table_.size()) return;
  if (opening_) opening_();
  try {
    link_.SetCommPort(port_table_[entry]);
    link_.SetBaudRate(kNetworkBaudRate);
    link_.SetPortOpen(true);
    link_.SetRTS(true);
  } catch (const RuntimeError& error) {
    ReportPortOpenError(error.number(), error.description());
  } catch (...) {
    ReportPortOpenError(kErrInternal, DescribeCurrentFault());
  }
}

void PortSelection::ReportPortOpenError(std::int32_t number, const std::string& description) {
  const std::string port = "The serial port (Comm" + std::to_string(link_.CommPort()) + ")";
  const std::string text =
      number == kErrPortAlreadyOpen
          ? port + " is in use.\r\nClose other programs that may have it open."
          : port + " has a problem.\r\nYou may need to select another port.\r\n\r\n" + description;
  boxes_.Show({text, kDefaultBoxTitle, BoxIcon::kExclamation});
}

}  // namespace tendril
