// OutputButton: a channel that drives no servo.
#pragma once

#include <QPushButton>

namespace tendril {

// A button that is selected or not, and then looks like a servo that is.
class OutputButton : public QPushButton {
  Q_OBJECT

 public:
  OutputButton();

  bool Selected() const { return selected_; }
  // Assistive technology is notified of a change.
  void Select(bool selected);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  bool selected_ = false;
};

}  // namespace tendril
