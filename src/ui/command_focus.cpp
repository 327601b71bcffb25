#include "ui/command_focus.h"

#include <utility>

namespace tendril {

void CommandFocus::Follow(bool running, const std::function<void()>& enable_controls) {
  const bool rested = std::exchange(resting_, running);
  if (running && !rested) {
    before_ = window_.focusWidget();
    window_.setFocus();
  }
  enable_controls();
  // A view that is hidden now takes no focus.
  if (!running && rested && before_ && before_->isVisible() && window_.focusWidget() == &window_)
    before_->setFocus();
}

}  // namespace tendril
