#include "unitops/port_selection.h"

#include <algorithm>

#include "platform/runtime_error.h"
#include "platform/serial_device.h"

namespace tendril {
namespace {

constexpr std::int16_t kLastListedPort = 25;
constexpr std::int32_t kNetworkBaudRate = 19200;

}  // namespace

PortSelection::PortSelection(HwSerial& link, MessageBoxes& boxes, ControlPanel& control_panel)
    : link_(link), boxes_(boxes), control_panel_(control_panel) {}

std::vector<std::string> PortSelection::RereadCommPorts(std::size_t& selected) {
  const std::int16_t port = selected < port_table_.size() ? port_table_[selected] : std::int16_t{0};
  std::vector<std::string> lines = ReadCommPorts(port);
  const auto found = std::find(port_table_.begin(), port_table_.end(), port);
  selected = static_cast<std::size_t>(found - port_table_.begin());
  return lines;
}

std::string PortSelection::DescribePort(std::size_t entry) const {
  if (entry == 0 || entry >= port_table_.size()) return {};
  const std::string device = link_.DescribeComPort(port_table_[entry]);
  return device.empty() ? "The device is not there at the moment." : device;
}

// Port `always` is listed even when it is gone.
std::vector<std::string> PortSelection::ReadCommPorts(std::int16_t always) {
  port_table_ = {0};
  std::vector<std::string> lines{"Select"};
  for (std::int16_t number = 1; number <= kLastListedPort; ++number) {
    if (number != always && !link_.ComPortExists(number)) continue;
    port_table_.push_back(number);
    lines.push_back(CommName(number));
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
  } catch (...) {
    const RuntimeError fault = CurrentFault();
    ReportPortOpenError(fault.number(), fault.description());
  }
}

void PortSelection::ReportPortOpenError(std::int32_t number, const std::string& description) {
  if (number == kErrPortAlreadyOpen && control_panel_.ControlPanelRunning()) {
    return control_panel_.AskControlPanelForPort(static_cast<std::uint8_t>(link_.CommPort()));
  }
  const std::string port = "The serial port (Comm" + std::to_string(link_.CommPort()) + ")";
  const std::string text =
      number == kErrPortAlreadyOpen
          ? port + " is in use.\r\nClose other programs that may have it open."
          : port + " has a problem.\r\nYou may need to select another port.\r\n\r\n" + description;
  boxes_.Show({text, kDefaultBoxTitle, BoxIcon::kExclamation});
}

}  // namespace tendril
