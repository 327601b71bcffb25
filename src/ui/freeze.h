// Freeze: keeps a window from being redrawn while many of its controls change.
#pragma once

#include <QObject>
#include <QPointer>
#include <QWidget>

namespace tendril {

// Suspends the redraw of a window for its own lifetime. What would have been redrawn meanwhile is redrawn
// once, when it ends; nothing else is. Several may freeze the same window and end in any order: the last one
// lets it be redrawn. The window may be destroyed meanwhile.
//
// It holds the window's update requests back. Disabling the window's updates would do as well, but enabling
// them again redraws the whole window, and most of it twice.
class Freeze : public QObject {
 public:
  Freeze() = default;
  ~Freeze() override { Unlock(); }

  // Freezes the window that `form` is or lies in, in place of the one frozen so far; none for nullptr.
  void SetForm(QWidget* form);

 protected:
  bool eventFilter(QObject* object, QEvent* event) override;

 private:
  void Unlock();

  QPointer<QWidget> window_;  // the one that is frozen
  bool held_back_ = false;    // a request of it was
};

}  // namespace tendril
