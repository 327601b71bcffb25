// OutputButton: a channel that drives no servo.
#pragma once

#include <QPushButton>

namespace tendril {

// A button that is selected or not, as a servo is. Its owner draws the difference.
class OutputButton : public QPushButton {
  Q_OBJECT

 public:
  using QPushButton::QPushButton;

  bool Selected() const { return selected_; }
  // Assistive technology is notified of a change.
  void Select(bool selected);

 private:
  bool selected_ = false;
};

}  // namespace tendril
