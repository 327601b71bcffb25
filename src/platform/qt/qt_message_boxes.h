// QtMessageBoxes: message boxes on QMessageBox.
#pragma once

#include <QMessageBox>
#include <QObject>
#include <QPointer>
#include <QWidget>
#include <vector>

#include "platform/message_boxes.h"

namespace tendril {

// A box is a QMessageBox named "messageBox". The program counts as being closed from CloseAll() on, from the
// end of the application's event loop on, or when a quit has taken a box away.
class QtMessageBoxes final : public MessageBoxes {
 public:
  QtMessageBoxes();
  ~QtMessageBoxes() override;

  // The window that boxes stand before; null for none. When it is destroyed, so is the box that stands before
  // it, unanswered.
  void SetParent(QWidget* parent) { parent_ = parent; }

  // Closes what is open, each question answered with No, and lets no box open from now on.
  void CloseAll();

  void Show(const BoxMessage& message) override;
  bool AskYesNo(const BoxMessage& message) override;

 private:
  // Shows a box with `buttons` until it is answered; the button, or NoButton when the box was taken away.
  QMessageBox::StandardButton Ask(const BoxMessage& message, QMessageBox::StandardButtons buttons);

  QPointer<QWidget> parent_;
  std::vector<QMessageBox*> open_;  // the last one is in front
  bool closing_ = false;
  QObject context_;  // what is connected ends with this object
};

}  // namespace tendril
