// ActualsFrame: the pop-up with the parameters as absolute pulse widths.
#pragma once

#include <QGroupBox>
#include <QLabel>
#include <array>

namespace tendril {

// The frame `fraActuals`. It floats over the window, hidden until it is asked for.
class ActualsFrame : public QGroupBox {
 public:
  explicit ActualsFrame(QWidget* parent);

 private:
  std::array<QLabel*, 6> values_{};
};

}  // namespace tendril
