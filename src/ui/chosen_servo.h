// ChosenServo: the large servo of the chosen channel, with a legend.
#pragma once

#include <QGroupBox>
#include <QLabel>
#include <QStackedWidget>
#include <cstddef>
#include <optional>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"
#include "ui/controls.h"
#include "ui/model/channel_editor.h"
#include "ui/servo_legend.h"
#include "ui/simulator_feed.h"
#include "unitops/live_test.h"

namespace tendril {

class ChosenServo : public QGroupBox, public ChannelChoice {
 public:
  // `editor` and `working`, its records, must outlive the area.
  ChosenServo(const ChannelEditor& editor, const ChannelTable& working);

  // Shows the edited channel's number, and its servo or what its port drives instead.
  void ShowChannel();
  // Shows Values() on the servo, with the arm at `arm`.
  void UpdateSimulator(Microseconds arm) { FeedSimulator(*ServoSimulator1_, Values(), arm); }
  // Moves the arm alone.
  void MoveArm(Microseconds arm) { ServoSimulator1_->SetMovingArmPositionUS(arm); }

  std::optional<std::size_t> Channel() const override { return editor_.Channel(); }
  ChannelConfig Values() const override;

 private:
  const ChannelEditor& editor_;
  const ChannelTable& working_;
  QStackedWidget* servo_or_output_;
  ServoSimulator* ServoSimulator1_;
  ServoLegend* legend_ = new ServoLegend;
  QLabel* lblOutput_;  // takes the servo's place when the port drives none
};

}  // namespace tendril
