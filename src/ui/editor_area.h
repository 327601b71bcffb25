// EditorArea: the parameters of one channel, beside its servo.
#pragma once

#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QSpinBox>
#include <QWidget>
#include <array>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"

namespace tendril {

class EditorArea : public QWidget {
 public:
  explicit EditorArea(QWidget* parent = nullptr);

  // Start-up: size and caption of the large simulator.
  void SetUpSimulator();
  // Start-up: ranges, steps and values of the spin buttons, and the captions beside them.
  void SetUpSpinButtons();
  // Start-up: lists the presets and selects the one that the records start from.
  void ListPresets();
  // Shows the values of the spin buttons on the large simulator, with the arm at `arm`, while no channel is
  // chosen.
  void UpdateSimulator(Microseconds arm);

 private:
  QWidget* MakeServo();
  QWidget* MakeMotionParameters();
  QWidget* MakeChoices();
  ChannelConfig SpinButtonValues() const;

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
