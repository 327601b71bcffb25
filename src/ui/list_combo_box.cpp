#include "ui/list_combo_box.h"

#include <QAbstractItemView>
#include <QKeyEvent>

namespace tendril {
namespace {

bool IsTyped(const QKeyEvent& event) {
  return !event.text().isEmpty() && event.text().front().isPrint() && event.key() != Qt::Key_Space &&
         !(event.modifiers() & (Qt::ControlModifier | Qt::AltModifier | Qt::MetaModifier));
}

}  // namespace

// view() would create the list.
bool ListComboBox::ListOpen() const {
  const auto* list = findChild<QAbstractItemView*>();
  return list != nullptr && list->isVisible();
}

void ListComboBox::keyPressEvent(QKeyEvent* event) {
  switch (event->key()) {
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
    case Qt::Key_Home:
    case Qt::Key_End:
      return showPopup();
    case Qt::Key_Return:
    case Qt::Key_Enter:
      if (event->isAutoRepeat()) return;  // the key has just chosen in the list
      return enter_ == Enter::kChoosesAgain ? Choose(currentIndex()) : showPopup();
    default:
      if (!IsTyped(*event)) return CalmComboBox::keyPressEvent(event);
      showPopup();
      view()->keyboardSearch(event->text());
  }
}

void ListComboBox::focusInEvent(QFocusEvent* event) {
  CalmComboBox::focusInEvent(event);
  Q_EMIT FocusArrived();
}

}  // namespace tendril
