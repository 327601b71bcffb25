#include "unitops/control_panel.h"

#include <string>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr char kListenerAddress[] = "127.0.0.1";
constexpr char kClientName[] = "Tendril Utility";
constexpr std::int32_t kAnswerCheckMs = 1000;

}  // namespace

ControlPanel::ControlPanel(TimerFactory& timers, MessageBoxes& boxes, TcpSocket& wsCLI, Registry& registry,
                           const ProcessList& processes)
    : boxes_(boxes),
      wsCLI_(wsCLI),
      processes_(processes),
      preferences_(registry),
      tmrCLIConnect_(timers.CreateTimer([this] { client_.OnConnectTimer(); })),
      tmrCLIReconnect_(timers.CreateTimer([this] { client_.OnReconnectTimer(); })),
      tmrCLIRequest_(timers.CreateTimer([this] { client_.OnRequestTimer(); })),
      answer_timer_(timers.CreateTimer([this] { OnAnswerTimer(); })) {
  answer_timer_->SetInterval(kAnswerCheckMs);
}

// The client uses the timers, which are gone before it.
ControlPanel::~ControlPanel() { client_.PrepareForShutdown(); }

void ControlPanel::ReadPreferences() { preferences_.InitFromRegistry(false); }

void ControlPanel::InitializeCommListenerInterface() {
  try {
    client_.InitializeControls(&wsCLI_, tmrCLIConnect_.get(), tmrCLIReconnect_.get(), tmrCLIRequest_.get());
    client_.SetLocalPort(0);
    client_.SetRemoteAddress(kListenerAddress);
    client_.SetRemotePort(preferences_.CommListenerPort());
    client_.Connect(false, kClientName, false, true);
  } catch (...) {
    const RuntimeError fault = CurrentFault();
    boxes_.Show({"Error in InitializeCommListenerInterface (" + std::to_string(fault.number()) +
                     "): " + fault.description(),
                 kDefaultBoxTitle});
  }
}

bool ControlPanel::ControlPanelRunning() const {
  return preferences_.CommListenerPort() > 0 && processes_.IsRunning(kControlPanelProgram);
}

void ControlPanel::AskControlPanelForPort(std::uint8_t port) {
  const bool yes = boxes_.AskYesNo(
      {"This serial port (Comm" + std::to_string(port) +
           ") is in use by the Control Panel.\r\n\r\n"
           "The Tendril Utility can tell the Control Panel to stop using the port, but this would cause your "
           "shows to be unable to control the lights on the port (until the Tendril Utility stops using the "
           "port).\r\n\r\n"
           "Would you like the Tendril Utility to tell the Control Panel to stop using the port?",
       "Port In Use"});
  if (!yes) return;
  if (requested_port_ && *requested_port_ != port) RelinquishPort();
  requested_port_ = port;
  client_.RequestCommPortControl(port);
  answer_timer_->SetEnabled(true);
  if (changed_) changed_();
  boxes_.Show(
      {"The Tendril Utility has asked the Control Panel to stop using the port.\r\n\r\n"
       "Try selecting the port again.",
       "Port Control Requested"});
}

PortControl ControlPanel::RequestState() const {
  return requested_port_ ? client_.CommPortControl(*requested_port_) : PortControl::kNone;
}

// Nothing handles the client's events, so its state is read.
void ControlPanel::OnAnswerTimer() {
  if (RequestState() == PortControl::kAsked) return;
  answer_timer_->SetEnabled(false);
  if (changed_) changed_();
}

void ControlPanel::RelinquishPort() {
  if (const auto port = std::exchange(requested_port_, std::nullopt)) {
    client_.RelinquishCommPortControl(*port);
  }
}

}  // namespace tendril
