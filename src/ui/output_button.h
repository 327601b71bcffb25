// OutputButton: a channel that drives no servo.
#pragma once

#include <QPushButton>
#include <QString>

namespace tendril {

// A button that is selected or not, and then looks like a servo that is.
class OutputButton : public QPushButton {
  Q_OBJECT

 public:
  // `caption` names the channel, below the text.
  explicit OutputButton(const QString& caption);

  bool Selected() const { return selected_; }
  // Assistive technology is notified of a change.
  void Select(bool selected);
  // See ServoSimulator.
  void Mark(bool marked);
  void MarkDiffers(bool differs);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  const QString caption_;
  bool selected_ = false;
  bool marked_ = false;
  bool differs_ = false;
};

}  // namespace tendril
