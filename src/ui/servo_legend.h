// ServoLegend: what the colours of the drawn servo stand for.
#pragma once

#include <QWidget>

namespace tendril {

// Ranges and lines stand on one line, or on one line each where that is too wide.
class ServoLegend : public QWidget {
 public:
  ServoLegend();

  QSize sizeHint() const override { return minimumSizeHint(); }
  QSize minimumSizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  bool two_lines_ = false;
};

}  // namespace tendril
