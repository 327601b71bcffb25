#include "ui/control_action.h"

#include <QEvent>
#include <utility>

namespace tendril {

ControlAction::ControlAction(const QString& text, const QKeySequence& key, QWidget& control,
                             std::function<void()> act, QObject* parent)
    : QAction(text, parent) {
  setShortcut(key);
  if (!key.isEmpty()) {
    Describe(&control,
             QStringLiteral("%1 (%2)").arg(control.toolTip(), key.toString(QKeySequence::NativeText)));
  }
  setEnabled(control.isEnabled() && control.isVisible());
  control.installEventFilter(this);
  connect(this, &QAction::triggered, &control, std::move(act));
}

ControlAction::ControlAction(const QString& text, const QKeySequence& key, QAbstractButton& button,
                             QObject* parent)
    : ControlAction(
          text, key, button, [&button] { button.click(); }, parent) {
  setCheckable(button.isCheckable());
  setChecked(button.isChecked());
  connect(&button, &QAbstractButton::toggled, this, &QAction::setChecked);
}

ControlAction::ControlAction(const QString& text, const QKeySequence& key, CalmComboBox& list,
                             QObject* parent)
    : ControlAction(
          text, key, list,
          [&list] {
            list.setFocus();
            Reveal(list);
            list.showPopup();
          },
          parent) {}

bool ControlAction::eventFilter(QObject* control, QEvent* event) {
  const QEvent::Type type = event->type();
  if (type == QEvent::EnabledChange || type == QEvent::Show || type == QEvent::Hide) {
    const auto* widget = static_cast<QWidget*>(control);
    setEnabled(widget->isEnabled() && widget->isVisible());
  }
  return QAction::eventFilter(control, event);
}

}  // namespace tendril
