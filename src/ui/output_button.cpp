#include "ui/output_button.h"

#include <QAccessible>
#include <QPainter>

#include "simulator/marks.h"
#include "simulator/servo_simulator.h"

namespace tendril {
namespace {

constexpr int kCaptionMargin = 8;  // below it

}  // namespace

OutputButton::OutputButton(const QString& caption) : caption_(caption) {
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

void OutputButton::Mark(bool marked) {
  if (marked == marked_) return;
  marked_ = marked;
  update();
}

void OutputButton::MarkDiffers(bool differs) {
  if (differs == differs_) return;
  differs_ = differs;
  update();
}

void OutputButton::paintEvent(QPaintEvent* event) {
  if (!selected_) QPushButton::paintEvent(event);
  QPainter painter(this);
  const QColor colour = selected_ ? QColor(Qt::white) : palette().color(QPalette::ButtonText);
  painter.setPen(colour);
  if (selected_) {
    PaintSelection(painter, rect(), palette(), ToColour(kSelectedBackground), hasFocus());
    painter.drawText(rect(), Qt::AlignCenter, text());
  }
  if (marked_) PaintMark(painter, rect(), colour);
  if (differs_) PaintDiffersMark(painter, QRectF(0, 0, height(), height()), colour);  // beside the caption
  QFont regular = font();
  regular.setBold(false);
  painter.setFont(regular);
  painter.setPen(colour);
  painter.drawText(rect().adjusted(0, 0, 0, -kCaptionMargin), Qt::AlignHCenter | Qt::AlignBottom, caption_);
}

}  // namespace tendril
