#include "ctl/borrowed_port.h"

#include "ctl/bounded_wait.h"

namespace tendril::ctl {
namespace {

// A listener that never replies is noticed at the third time-out, of a second each; one that takes no connection at the
// first, of five seconds.
constexpr std::int32_t kAnswerLimitMs = 6000;
// After a reply that was missed, the request is repeated before the port is given back.
constexpr std::int32_t kGiveBackLimitMs = 4000;

}  // namespace

BorrowedPort::BorrowedPort(Environment& environment)
    : environment_(environment),
      control_panel_(environment.timers, *this, environment.socket, environment.registry,
                     environment.processes) {}

// Where no Control Panel runs, there may be no preferences to read.
bool BorrowedPort::ControlPanelRunning() {
  if (!environment_.processes.IsRunning(kControlPanelProgram)) return false;
  control_panel_.ReadPreferences();
  return control_panel_.ControlPanelRunning();
}

std::string BorrowedPort::Borrow(std::uint8_t number) {
  control_panel_.InitializeCommListenerInterface();
  control_panel_.AskControlPanelForPort(number);
  WaitUntil(environment_, kAnswerLimitMs, [this] {
    return control_panel_.RequestState() != PortControl::kAsked || environment_.stop.Made();
  });
  switch (control_panel_.RequestState()) {
    case PortControl::kGranted:
      return {};
    case PortControl::kRefused:
      return "the Control Panel refuses to give it up";
    case PortControl::kNone:
    case PortControl::kAsked:
    case PortControl::kUnanswered:
      break;
  }
  return "the Control Panel gives no answer: try again, or restart it";
}

bool BorrowedPort::GiveBack() {
  if (!control_panel_.RequestedPort()) return true;
  const bool sent = control_panel_.RequestState() != PortControl::kAsked || control_panel_.Connected();
  control_panel_.RelinquishPort();
  return !sent ||
         WaitUntil(environment_, kGiveBackLimitMs, [this] { return !control_panel_.RequestPending(); });
}

}  // namespace tendril::ctl
