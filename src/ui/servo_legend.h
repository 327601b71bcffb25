// ServoLegend: what the colours of the drawn servo stand for.
#pragma once

#include <QWidget>
#include <cstddef>

namespace tendril {

// Stands on one line, or on two or three where that is too wide.
class ServoLegend : public QWidget {
 public:
  ServoLegend();

  QSize sizeHint() const override { return minimumSizeHint(); }
  QSize minimumSizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  std::size_t EntriesInLine() const;

  std::size_t in_line_ = 6;
};

}  // namespace tendril
