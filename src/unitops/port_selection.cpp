#include "unitops/port_selection.h"

#include <algorithm>

#include "platform/runtime_error.h"
#include "platform/serial_device.h"

namespace tendril {
namespace {

constexpr std::int16_t kLastListedPort = 25;
constexpr std::int32_t kNetworkBaudRate = 19200;

// What went wrong, of the link's description of a failed opening: "Open of ... Error: (8020) What went wrong.\r\n ...".
// All of the first line of any other description.
std::string ShortReason(const std::string& description) {
  const std::size_t number = description.find("Error: (");
  const std::size_t begin = number == description.npos ? 0 : description.find(") ", number) + 2;
  std::string reason = description.substr(begin, description.find("\r\n", begin) - begin);
  if (reason.ends_with('.')) reason.pop_back();
  return reason;
}

}  // namespace

PortSelection::PortSelection(HwSerial& link, MessageBoxes& boxes, ControlPanel& control_panel)
    : link_(link), boxes_(boxes), control_panel_(control_panel) {
  control_panel_.SetChangedHandler([this] { Changed(); });
}

PortSelection::~PortSelection() {
  control_panel_.SetChangedHandler(nullptr);
  link_.WatchComPorts(nullptr);
}

std::vector<std::string> PortSelection::ListCommPorts() {
  std::vector<std::string> lines = ReadCommPorts(0);
  Changed();
  return lines;
}

std::vector<std::string> PortSelection::RereadCommPorts(std::size_t& selected) {
  const std::int16_t port = selected < port_table_.size() ? port_table_[selected] : std::int16_t{0};
  std::vector<std::string> lines = ReadCommPorts(port);
  const auto found = std::find(port_table_.begin(), port_table_.end(), port);
  selected = static_cast<std::size_t>(found - port_table_.begin());
  if (kept_.chosen != 0 && !link_.PortOpen()) {
    const bool there = link_.ComPortExists(kept_.chosen);
    if (!there) kept_.fault = PortFault::kGone;
    kept_.back = there && kept_.fault == PortFault::kGone;
  }
  Changed();
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
  if (entry >= port_table_.size()) return;
  kept_ = {.chosen = port_table_[entry], .device = kept_.device};
  if (kept_.chosen == 0) return Changed();
  if (opening_) opening_();
  choosing_ = true;
  try {
    link_.SetCommPort(kept_.chosen);
    link_.SetBaudRate(kNetworkBaudRate);
    link_.SetPortOpen(true);
    link_.SetRTS(true);
  } catch (...) {
    choosing_ = false;
    return ReportPortOpenError(CurrentFault());
  }
  choosing_ = false;
  Changed();
}

// A port that closes while none is being chosen has lost its device, unless the program has set another one: it does so
// to close the port for good.
void PortSelection::OnPort(bool open) {
  if (open) {
    kept_ = {.chosen = kept_.chosen, .device = link_.DescribeComPort(link_.CommPort())};
  } else if (!choosing_ && link_.CommPort() == kept_.chosen) {
    kept_.fault = PortFault::kGone;
  }
  if (!choosing_) Changed();
}

PortFacts PortSelection::Facts() const {
  PortFacts facts = kept_;
  facts.any_listed = port_table_.size() > 1;
  facts.open = link_.PortOpen() ? link_.CommPort() : std::int16_t{0};
  facts.requested = control_panel_.RequestedPort().value_or(0);
  facts.request = control_panel_.RequestState();
  return facts;
}

void PortSelection::Changed() const {
  if (changed_) changed_();
}

void PortSelection::ReportPortOpenError(const RuntimeError& fault) {
  const bool in_use = fault.number() == kErrPortAlreadyOpen;
  const bool control_panel = in_use && control_panel_.ControlPanelRunning();
  KeepWhyNotOpen(fault, control_panel);
  Changed();
  if (control_panel) {
    return control_panel_.AskControlPanelForPort(static_cast<std::uint8_t>(link_.CommPort()));
  }
  const std::string port = "The serial port (Comm" + std::to_string(link_.CommPort()) + ")";
  const std::string text =
      in_use ? port + " is in use.\r\nClose other programs that may have it open."
             : port + " has a problem.\r\nYou may need to select another port.\r\n\r\n" + fault.description();
  boxes_.Show({text, kDefaultBoxTitle, BoxIcon::kExclamation});
}

void PortSelection::KeepWhyNotOpen(const RuntimeError& fault, bool control_panel) {
  switch (fault.number()) {
    case kErrPortAlreadyOpen:
      kept_.fault = control_panel ? PortFault::kControlPanelHasIt : PortFault::kInUse;
      kept_.holder = link_.ComPortHolder(kept_.chosen);
      return;
    case kErrNotAllowed:
      kept_.fault = PortFault::kNotAllowed;
      return;
    default:
      kept_.fault = link_.ComPortExists(kept_.chosen) ? PortFault::kOther : PortFault::kGone;
      kept_.reason = ShortReason(fault.description());
  }
}

}  // namespace tendril
