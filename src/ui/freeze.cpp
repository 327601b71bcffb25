#include "ui/freeze.h"

#include <QCoreApplication>
#include <QEvent>

namespace tendril {

void Freeze::SetForm(QWidget* form) {
  Unlock();
  if (form == nullptr) return;
  window_ = form->window();
  window_->installEventFilter(this);
}

bool Freeze::eventFilter(QObject* object, QEvent* event) {
  if (event->type() != QEvent::UpdateRequest) return QObject::eventFilter(object, event);
  held_back_ = true;
  return true;
}

void Freeze::Unlock() {
  if (window_ != nullptr) {
    window_->removeEventFilter(this);
    // The window does not request the update again: it expects the first request to arrive.
    if (held_back_) {
      QCoreApplication::postEvent(window_, new QEvent(QEvent::UpdateRequest), Qt::LowEventPriority);
    }
  }
  window_ = nullptr;
  held_back_ = false;
}

}  // namespace tendril
