// QtMessageBoxes: message boxes on QMessageBox.
#pragma once

#include <QMessageBox>
#include <QObject>
#include <QPointer>
#include <QWidget>
#include <vector>

#include "platform/message_boxes.h"

namespace tendril {

// A box is a QMessageBox named "messageBox". Ctrl+C copies its title and text. The program counts as being closed after CloseAll(), after the end of the
// application's event loop, or when a quit has closed a box.
class QtMessageBoxes final : public MessageBoxes {
 public:
  QtMessageBoxes();
  ~QtMessageBoxes() override;

  // The main window, or null. A box belongs to it, or to the active one of its windows that are not modal. A box that is
  // open when the window is destroyed ends unanswered.
  void SetParent(QWidget* parent) { parent_ = parent; }

  // Closes the open boxes, questions with No, and lets no further box open.
  void CloseAll();

  void Show(const BoxMessage& message) override;
  bool AskYesNo(const BoxMessage& message) override;

 private:
  // Shows a box with `buttons`; returns the button, or NoButton when the box was closed without an answer.
  QMessageBox::StandardButton Ask(const BoxMessage& message, QMessageBox::StandardButtons buttons);

  QWidget* Owner() const;

  QPointer<QWidget> parent_;
  std::vector<QMessageBox*> open_;  // the last is in front
  bool closing_ = false;
  QObject context_;  // ends the connections
};

}  // namespace tendril
