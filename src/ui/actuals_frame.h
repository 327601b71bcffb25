// ActualsFrame: the pop-up with the parameters as absolute pulse widths.
#pragma once

#include <QLabel>
#include <array>
#include <memory>

#include "config/channel_config.h"
#include "platform/timer.h"
#include "ui/controls.h"

namespace tendril {

// The frame `fraActuals`. Hides itself after a second.
class ActualsFrame : public PopUp {
 public:
  // `window` owns it.
  ActualsFrame(TimerFactory& timers, QWidget& window);

  // Opens beside `label`, for one timer period.
  void ShowActuals(const QWidget& label);
  // Sets what it shows.
  void SetValues(const ChannelConfig& values);

 private:
  std::array<QLabel*, 6> values_{};
  std::unique_ptr<Timer> tmrShowActuals_;
};

}  // namespace tendril
