#include "ui/elided_label.h"

#include <QPainter>
#include <QStyle>
#include <utility>

namespace tendril {

void PaintElided(QLabel& label) {
  QPainter painter(&label);
  const QRect room = label.contentsRect();
  label.style()->drawItemText(
      &painter, room, Qt::AlignLeft | Qt::AlignVCenter, label.palette(), label.isEnabled(),
      label.fontMetrics().elidedText(label.text(), Qt::ElideRight, room.width()), label.foregroundRole());
}

ElidedLabel::ElidedLabel(QString what) : what_(std::move(what)) {
  setTextFormat(Qt::PlainText);
  setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
  setAccessibleName(what_);
}

void ElidedLabel::Show(const QString& text) {
  if (text == this->text()) return;
  setText(text);
  setToolTip(text);
  setAccessibleName(what_ + QStringLiteral(": ") + text);
}

void ElidedLabel::paintEvent(QPaintEvent* /*event*/) { PaintElided(*this); }

}  // namespace tendril
