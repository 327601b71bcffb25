#include "ui/wrapping_row.h"

#include <QHBoxLayout>
#include <algorithm>

#include "ui/controls.h"

namespace tendril {

WrappingRow::WrappingRow(QWidget* first, QWidget* second)
    : row_(AddLayout<QHBoxLayout>(this, {})), first_(first), second_(second) {
  row_->addWidget(first);
  row_->addWidget(second, 1);
}

QSize WrappingRow::minimumSizeHint() const {
  return {std::max(first_->minimumSizeHint().width(), second_->minimumSizeHint().width()),
          row_->minimumSize().height()};
}

void WrappingRow::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  const int needed = first_->minimumSizeHint().width() + row_->spacing() + second_->minimumSizeHint().width();
  const auto direction = width() < needed ? QBoxLayout::TopToBottom : QBoxLayout::LeftToRight;
  if (direction != row_->direction()) row_->setDirection(direction);
}

}  // namespace tendril
