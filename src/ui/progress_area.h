// ProgressArea: the bar that shows that a unit command runs, and how it ended.
#pragma once

#include <QLabel>
#include <QStackedLayout>
#include <QWidget>

#include "ui/controls.h"
#include "unitops/running_command.h"

namespace tendril {

// The frame `frmProgress`. It shares its place with another widget, the frame of the apply boxes: nothing
// around them moves when one gives way to the other.
class ProgressArea : public FrameBox, public CommandProgressView {
 public:
  ProgressArea();

  // Puts `other` and this area into `place`. `other` is shown while this is not, and first.
  void SharePlace(QStackedLayout& place, QWidget* other);
  // Names what runs in the frame's title, until the next command; or where it stopped without showing an outcome.
  void ShowRunning(const RunningCommand& running);

  void ShowProgress(bool shown) override;
  int FrameWidth() const override;
  void SetBarWidth(int width) override;
  void SetColour(ProgressColour colour) override;
  void SetText(const std::string& text) override;

 protected:
  void changeEvent(QEvent* event) override;

 private:
  void ApplyColour();

  QStackedLayout* place_ = nullptr;
  QWidget* pctProgress_;    // the bar's trough
  QWidget* ShapeProgress_;  // the bar
  QLabel* lblProgress_;
  ProgressColour colour_ = ProgressColour::kBlue;
};

}  // namespace tendril
