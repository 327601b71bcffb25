// SimulatedBoxes: message boxes that a test reads and answers.
#pragma once

#include <functional>
#include <utility>
#include <vector>

#include "platform/message_boxes.h"

namespace tendril::test {

class SimulatedBoxes final : public MessageBoxes {
 public:
  void Show(const BoxMessage& message) override {
    shown.push_back(message);
    if (while_open) while_open();
  }
  bool AskYesNo(const BoxMessage& message) override {
    Show(message);
    return answer_yes;
  }

  // Takes what was shown since the last call.
  std::vector<BoxMessage> Take() { return std::exchange(shown, {}); }

  std::vector<BoxMessage> shown;
  bool answer_yes = false;
  // Runs while a box is open, as the event loop does.
  std::function<void()> while_open;
};

}  // namespace tendril::test
