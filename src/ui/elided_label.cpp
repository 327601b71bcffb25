#include "ui/elided_label.h"

#include <QPainter>
#include <QStyle>
#include <utility>

namespace tendril {

ElidedLabel::ElidedLabel(QString what) : what_(std::move(what)) {
  setTextFormat(Qt::PlainText);
  setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Fixed);
  setAccessibleName(what_);
}

void ElidedLabel::Show(const QString& text) {
  if (text == this->text()) return;
  setText(text);
  setToolTip(text);
  setAccessibleName(what_ + QStringLiteral(": ") + text);
}

void ElidedLabel::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  const QRect room = contentsRect();
  style()->drawItemText(&painter, room, Qt::AlignLeft | Qt::AlignVCenter, palette(), isEnabled(),
                        fontMetrics().elidedText(text(), Qt::ElideRight, room.width()), foregroundRole());
}

}  // namespace tendril
