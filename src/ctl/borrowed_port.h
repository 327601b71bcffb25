// BorrowedPort: a port that the Control Panel gives up for the time of a command.
#pragma once

#include <cstdint>
#include <string>

#include "ctl/environment.h"
#include "platform/message_boxes.h"
#include "unitops/control_panel.h"

namespace tendril::ctl {

// Asks the Control Panel as the window does after Yes. It connects to the Control Panel only in Borrow().
class BorrowedPort final : private MessageBoxes {
 public:
  // The environment must outlive it.
  explicit BorrowedPort(Environment& environment);

  // Whether the Control Panel runs on this computer and can be asked.
  bool ControlPanelRunning();
  // Asks for port `number` and waits until the Control Panel has given it up. Returns why it has not: half a sentence,
  // "the Control Panel refuses to give it up". Also ends at a stop request.
  std::string Borrow(std::uint8_t number);
  // Gives back what was asked for, and waits until that has been sent. The port must be closed. False: it could not be
  // sent in time.
  bool GiveBack();

 private:
  // MessageBoxes: --take-port is the user's Yes.
  void Show(const BoxMessage& /*message*/) override {}
  bool AskYesNo(const BoxMessage& /*message*/) override { return true; }

  Environment& environment_;
  ControlPanel control_panel_;
};

}  // namespace tendril::ctl
