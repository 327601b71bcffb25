// CommandFocus: where the keyboard focus is while a unit command runs.
#pragma once

#include <QPointer>
#include <QWidget>
#include <functional>

namespace tendril {

// Disabling a control moves its focus on to some servo or button, and scrolls there. So the focus rests on the window
// while a command runs, and then goes back, unless the user has moved it.
class CommandFocus {
 public:
  // `window` must outlive this object.
  explicit CommandFocus(QWidget& window) : window_(window) {}

  // A command runs, or none does any more. Calls `enable_controls`, which disables and enables the controls accordingly.
  void Follow(bool running, const std::function<void()>& enable_controls);

 private:
  QWidget& window_;
  bool resting_ = false;
  QPointer<QWidget> before_;  // where the focus was when the command began
};

}  // namespace tendril
