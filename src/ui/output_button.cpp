#include "ui/output_button.h"

#include <QAccessible>
#include <QPainter>

#include "simulator/servo_simulator.h"

namespace tendril {

OutputButton::OutputButton() {
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  QFont bold = font();
  bold.setBold(true);
  setFont(bold);
}

void OutputButton::Select(bool selected) {
  if (selected == selected_) return;
  selected_ = selected;
  QAccessibleEvent event(this, selected ? QAccessible::SelectionAdd : QAccessible::SelectionRemove);
  QAccessible::updateAccessibility(&event);
  update();
}

void OutputButton::paintEvent(QPaintEvent* event) {
  if (!selected_) return QPushButton::paintEvent(event);
  QPainter painter(this);
  PaintSelection(painter, rect(), palette(), ToColour(kSelectedBackground), hasFocus());
  painter.setPen(Qt::white);
  painter.drawText(rect(), Qt::AlignCenter, text());
}

}  // namespace tendril
