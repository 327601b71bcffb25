#include "ui/controls.h"

#include <QPalette>
#include <QWheelEvent>

namespace tendril {

void CalmComboBox::wheelEvent(QWheelEvent* event) { event->ignore(); }

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

bool IsDark(const QWidget& widget) {
  const QPalette& palette = widget.palette();
  return palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness();
}

}  // namespace tendril
