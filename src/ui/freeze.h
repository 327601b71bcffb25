// Freeze: suspends the redraw of a window while many of its controls change.
#pragma once

#include <QObject>
#include <QPointer>
#include <QWidget>

namespace tendril {

// Suspends the redraw of a window for its own lifetime. At the end, what has changed is redrawn once. Several objects
// may freeze the same window and end in any order: the last one resumes the redraw. The window may be destroyed
// meanwhile.
//
// Holds the window's update requests back. Disabling the window's updates would work too, but enabling them again
// redraws the whole window, and most of it twice.
class Freeze : public QObject {
 public:
  Freeze() = default;
  ~Freeze() override { Unlock(); }

  // Freezes the window that contains `form`, instead of the one frozen so far; none for nullptr.
  void SetForm(QWidget* form);

 protected:
  bool eventFilter(QObject* object, QEvent* event) override;

 private:
  void Unlock();

  QPointer<QWidget> window_;  // the frozen one
  bool held_back_ = false;    // it has requested an update
};

}  // namespace tendril
