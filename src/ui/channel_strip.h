// ChannelStrip: the eight servos.
#pragma once

#include <QPushButton>
#include <QStackedWidget>
#include <array>
#include <cstddef>
#include <functional>
#include <utility>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"
#include "ui/controls.h"

namespace tendril {

class ChannelStrip : public FrameBox {
 public:
  // `working` are the records that are shown; they must outlive the strip.
  explicit ChannelStrip(const ChannelTable& working, QWidget* parent = nullptr);

  // Start-up: captions and output labels.
  void SetUpSimulators();
  // What happens when the person chooses a channel, 0 to 7.
  void SetSelectHandler(std::function<void(std::size_t channel)> handler) { select_ = std::move(handler); }
  // Marks `channel` as the chosen one.
  void ShowSelected(std::size_t channel);
  // Shows each channel as what its record's output kind says: a servo, or a button with the kind's name.
  void ShowKinds();
  // Shows the record of `channel`, with the arm at `arm`.
  void UpdateSimulator(std::size_t channel, Microseconds arm);
  // Moves the arm alone.
  void MoveArm(std::size_t channel, Microseconds arm);

 private:
  void ShowKind(std::size_t slot);

  const ChannelTable& working_;
  std::function<void(std::size_t)> select_;
  std::array<Microseconds, kPortCount> arms_{};  // where each arm was drawn last
  std::array<ServoSimulator*, kPortCount> ServoSimulator2_{};
  // Each shows either of the two.
  std::array<QStackedWidget*, kPortCount> cells_{};
  // What stands in the servo's place when the port drives no servo.
  std::array<QPushButton*, kPortCount> cmdDigitalOutput_{};
};

}  // namespace tendril
