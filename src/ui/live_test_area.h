// LiveTestArea: the controls that move a servo live, with their warning.
#pragma once

#include <QCheckBox>
#include <QGroupBox>
#include <QLabel>
#include <QSlider>
#include <QString>
#include <array>
#include <optional>

#include "ui/controls.h"
#include "ui/motion_parameters.h"
#include "unitops/live_test.h"

namespace tendril {

// The slider, its read-outs and its box. The test buttons are part of MotionParameters.
class LiveTestArea : public QGroupBox, public LiveTestView {
  Q_OBJECT

 public:
  // `tests` has the test buttons, and must outlive the area.
  explicit LiveTestArea(MotionParameters& tests);

  // Enables slider and test buttons. `running_command` is what runs; empty when nothing does.
  void EnableControls(const QString& running_command);

  // Whether a sweep runs.
  bool Sweeps() const { return running_test_.has_value(); }
  // Whether something moves the servo, or can: a sweep, or the slider while its box is ticked.
  bool Moves() const { return Sweeps() || SliderSends(); }

  void ShowTestRunning(int button, bool running) override;
  int SliderValue() const override { return HScrollSendServoPosition_->value(); }
  void SetSlider(int value) override;
  void ShowReadOut(const SliderReadOut& read_out) override;
  bool SliderSends() const override { return chkSendSlideCommands_->isChecked(); }
  void ClearSliderSends() override { chkSendSlideCommands_->setChecked(false); }

 Q_SIGNALS:
  // The user moved the slider.
  void SliderMoved();
  // "Use Slider to Test Intensity Values" was ticked or cleared.
  void SliderSendsChanged();
  // A sweep has begun or ended.
  void SweepChanged();

 protected:
  void changeEvent(QEvent* event) override;

 private:
  void ColourWarning();

  MotionParameters& tests_;
  std::optional<int> running_test_;
  QWidget* warning_;  // with its sign
  QSlider* HScrollSendServoPosition_;
  QCheckBox* chkSendSlideCommands_;
  std::array<QLabel*, 3> read_outs_{};
};

}  // namespace tendril
