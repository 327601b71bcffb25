// EditorArea: the channel that is edited: its servo, large, beside its parameters and choices.
#pragma once

#include <QLabel>
#include <QPushButton>
#include <QStackedWidget>
#include <QWidget>
#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"
#include "ui/channel_choices.h"
#include "ui/model/channel_editor.h"
#include "ui/motion_parameters.h"
#include "unitops/live_test.h"

namespace tendril {

class EditorArea : public QWidget, public ChannelChoice {
 public:
  // What the window does when the person edits.
  struct Events {
    MotionParameters::Events parameters;
    ChannelChoices::Events choices;
  };

  // `editor` and `working`, its records, must outlive the area. `test_buttons` find their places here.
  EditorArea(ChannelEditor& editor, const ChannelTable& working, Events events,
             const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons, QWidget* parent = nullptr);

  // Start-up: size and caption of the large simulator.
  void SetUpSimulator();
  // Start-up: lists the presets and selects the one that the records start from.
  void ListPresets() { choices_->ListPresets(); }

  // Shows what the editor holds, and the edited channel's choices and caption. Runs no handler.
  void ShowEditor();
  // Shows Values() on the large simulator, with the arm at `arm`.
  void UpdateSimulator(Microseconds arm);
  // Shows what is to be said about the records.
  void ShowRemarks(const std::vector<std::string>& sentences) { parameters_->ShowRemarks(sentences); }
  // Moves the arm alone.
  void MoveArm(Microseconds arm);

  std::optional<std::size_t> Channel() const override { return editor_.Channel(); }
  ChannelConfig Values() const override;

 private:
  QWidget* MakeServo();

  ChannelEditor& editor_;
  const ChannelTable& working_;
  MotionParameters* parameters_;
  ChannelChoices* choices_;
  QStackedWidget* servo_or_output_ = nullptr;
  ServoSimulator* ServoSimulator1_ = nullptr;
  QLabel* lblOutput_ = nullptr;  // stands in the servo's place when the port drives none
  Microseconds arm_ = kCentrePulseWidth;
};

}  // namespace tendril
