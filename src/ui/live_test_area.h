// LiveTestArea: the controls that move a servo live, with their warning.
#pragma once

#include <QCheckBox>
#include <QLabel>
#include <QPushButton>
#include <QSlider>
#include <QString>
#include <array>

#include "ui/controls.h"
#include "unitops/live_test.h"
#include "unitops/running_command.h"

namespace tendril {

// The slider, its read-outs and its box lie in the area itself. The test buttons stand elsewhere, each beside
// the parameter that it tests.
class LiveTestArea : public FrameBox, public LiveTestView {
 public:
  explicit LiveTestArea(QWidget* parent = nullptr);

  // The test buttons; whoever lays them out becomes their parent.
  const std::array<QPushButton*, LiveTest::kTestButtons>& TestButtons() const { return cmdTest_; }
  // Lets the controls act on `test`, which must outlive them.
  void Connect(LiveTest& test);
  // Nothing can be moved while a unit command runs.
  void ShowRunning(const RunningCommand& running);

  void ShowTestRunning(int button, bool running) override;
  int SliderValue() const override;
  void SetSlider(int value) override;
  void ShowReadOut(const SliderReadOut& read_out) override;
  bool SliderSends() const override;
  void ClearSliderSends() override;

 protected:
  void changeEvent(QEvent* event) override;

 private:
  void ColourWarning();
  void EnableControls();

  QLabel* warning_;
  QSlider* HScrollSendServoPosition_;
  QCheckBox* chkSendSlideCommands_;
  std::array<QLabel*, 3> read_outs_{};
  std::array<QPushButton*, LiveTest::kTestButtons> cmdTest_{};
  QString running_command_;  // what runs; empty when nothing does
};

}  // namespace tendril
