// ChannelStrip: the eight servos.
#pragma once

#include <QGroupBox>
#include <QPushButton>
#include <array>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"

namespace tendril {

class ChannelStrip : public QGroupBox {
 public:
  // `working` are the records that are shown; they must outlive the strip.
  explicit ChannelStrip(const ChannelTable& working, QWidget* parent = nullptr);

  // Start-up: captions and output labels.
  void SetUpSimulators();
  // Shows all eight records, with the arms at `arm`.
  void UpdateSimulators(Microseconds arm);

 private:
  const ChannelTable& working_;
  Microseconds arm_ = kCentrePulseWidth;
  std::array<ServoSimulator*, kPortCount> ServoSimulator2_{};
  // What stands in the servo's place when the port drives no servo.
  std::array<QPushButton*, kPortCount> cmdDigitalOutput_{};
};

}  // namespace tendril
