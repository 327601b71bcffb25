#include "ui/escape_key.h"

#include <QEvent>
#include <QKeyEvent>
#include <algorithm>

namespace tendril {

EscapeKey::EscapeKey(QWidget& window, std::vector<Step> steps) : QObject(&window), steps_(std::move(steps)) {
  window.installEventFilter(this);
}

// The controls pass on to the window what they do not use.
bool EscapeKey::eventFilter(QObject* window, QEvent* event) {
  if (event->type() != QEvent::KeyPress) return QObject::eventFilter(window, event);
  const auto& key = static_cast<QKeyEvent&>(*event);
  if (key.key() != Qt::Key_Escape || key.modifiers() != Qt::NoModifier) return false;
  if (key.isAutoRepeat()) return true;  // a held key is one press
  return std::any_of(steps_.begin(), steps_.end(), [](const Step& step) { return step(); });
}

}  // namespace tendril
