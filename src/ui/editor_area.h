// EditorArea: the parameters of one channel, beside its servo.
#pragma once

#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QSpinBox>
#include <QWidget>
#include <array>
#include <cstddef>
#include <optional>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"
#include "unitops/live_test.h"

namespace tendril {

class EditorArea : public QWidget, public ChannelChoice {
 public:
  // `working` are the records, which must outlive the area. `test_buttons` find their places here.
  EditorArea(const ChannelTable& working,
             const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons, QWidget* parent = nullptr);

  // Start-up: size and caption of the large simulator.
  void SetUpSimulator();
  // Start-up: ranges, steps and values of the spin buttons, and the captions beside them.
  void SetUpSpinButtons();
  // Start-up: lists the presets and selects the one that the records start from.
  void ListPresets();
  // Makes `channel`, 0 to 7, the chosen one and shows its record; nothing is stored.
  void LoadChannel(std::size_t channel);
  // Shows Values() on the large simulator, with the arm at `arm`.
  void UpdateSimulator(Microseconds arm);
  // Moves the arm alone.
  void MoveArm(Microseconds arm);

  std::optional<std::size_t> Channel() const override { return channel_; }
  ChannelConfig Values() const override;

 private:
  QWidget* MakeServo();
  QWidget* MakeMotionParameters(const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons);
  QWidget* MakeChoices();
  ChannelConfig SpinButtonValues() const;
  void ShowCaptions();

  const ChannelTable& working_;
  std::optional<std::size_t> channel_;
  Microseconds arm_ = kCentrePulseWidth;
  QGroupBox* servo_frame_ = nullptr;
  ServoSimulator* ServoSimulator1_ = nullptr;

  QSpinBox* spnActPulseRange_ = nullptr;
  QSpinBox* spnVirtPulseRange_ = nullptr;
  QSpinBox* spnNeutralTrim_ = nullptr;
  QSpinBox* spnLeftVirtStop_ = nullptr;
  QSpinBox* spnRightVirtStop_ = nullptr;
  QSpinBox* spnDefaultPos_ = nullptr;
  QLabel* lblActPulseLeft_ = nullptr;
  QLabel* lblActPulseRight_ = nullptr;
  QLabel* lblVirtPulseRange_ = nullptr;
  QLabel* lblNeutralTrim_ = nullptr;
  QLabel* lblLeftVirtStop_ = nullptr;
  QLabel* lblRightVirtStop_ = nullptr;
  QLabel* lblDefaultPos_ = nullptr;
  QComboBox* cmbPresets_ = nullptr;
};

}  // namespace tendril
