#include "ui/controls.h"

#include <QAbstractButton>
#include <QPalette>
#include <QSignalBlocker>
#include <QWheelEvent>
#include <algorithm>

#include "config/channel_config.h"

namespace tendril {

void CalmComboBox::wheelEvent(QWheelEvent* event) { event->ignore(); }

CalmSpinBox::CalmSpinBox(QWidget* parent) : QSpinBox(parent) {
  setKeyboardTracking(false);
  setFocusPolicy(Qt::StrongFocus);
  setSingleStep(10);
  setSuffix(QStringLiteral(" µs"));
  setRange(-BoundedValue::kWidest, BoundedValue::kWidest);
  setFixedWidth(sizeHint().width());  // whatever its limits become, nothing around it moves
}

void CalmSpinBox::Show(const BoundedValue& value) {
  const QSignalBlocker silent(this);
  setRange(value.Minimum(), value.Maximum());
  setValue(value.Value());
}

void CalmSpinBox::wheelEvent(QWheelEvent* event) {
  if (hasFocus()) {
    QSpinBox::wheelEvent(event);
  } else {
    event->ignore();
  }
}

QString ArrayName(const QString& array, int index) { return QStringLiteral("%1_%2").arg(array).arg(index); }

void Describe(QWidget* widget, const QString& what_it_does) { widget->setToolTip(what_it_does); }

void Disable(QWidget* widget, const QString& why) {
  widget->setEnabled(false);
  Describe(widget, why);
}

QLabel* DimLabel(const QString& text, QWidget* parent) {
  auto* label = new QLabel(text, parent);
  label->setForegroundRole(QPalette::PlaceholderText);
  return label;
}

QLabel* BoldLabel(const QString& text, QWidget* parent) {
  auto* label = new QLabel(text, parent);
  QFont font = label->font();
  font.setBold(true);
  label->setFont(font);
  return label;
}

void CheckOnly(QButtonGroup& group, int id) {
  group.setExclusive(false);  // an exclusive group does not let go of its last button
  for (QAbstractButton* button : group.buttons()) button->setChecked(group.id(button) == id);
  group.setExclusive(true);
}

QPoint WithinParent(const QWidget& panel, QPoint wanted) {
  const QSize room = panel.parentWidget()->size() - panel.size();
  return {std::max(0, std::min(wanted.x(), room.width())), std::max(0, std::min(wanted.y(), room.height()))};
}

QString OutputLabel(std::int16_t port_type) {
  switch (port_type) {
    case kPortDigital:
      return QStringLiteral("DIGITAL\nPORT");
    case kPortPwm:
      return QStringLiteral("PWM\nPORT");
    default:
      return {};
  }
}

bool IsDark(const QWidget& widget) {
  const QPalette& palette = widget.palette();
  return palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness();
}

}  // namespace tendril
