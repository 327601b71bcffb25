// ActualsFrame: the pop-up with the parameters as absolute pulse widths.
#pragma once

#include <QFrame>
#include <QLabel>
#include <array>
#include <memory>

#include "config/channel_config.h"
#include "platform/timer.h"

namespace tendril {

// The frame `fraActuals`. It floats over the window, hidden until it is asked for, and hides itself after a second.
class ActualsFrame : public QFrame {
 public:
  // `window` owns it.
  ActualsFrame(TimerFactory& timers, QWidget& window);

  // Pops up beside `label`, for one timer period.
  void ShowActuals(const QWidget& label);
  // Sets what it shows.
  void SetValues(const ChannelConfig& values);

 private:
  std::array<QLabel*, 6> values_{};
  std::unique_ptr<Timer> tmrShowActuals_;
};

}  // namespace tendril
