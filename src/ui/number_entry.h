// NumberEntry: the panel in which a value of the summary is changed.
#pragma once

#include <QFrame>
#include <QLabel>
#include <QPointer>
#include <array>
#include <cstddef>
#include <functional>
#include <memory>

#include "platform/timer.h"
#include "ui/controls.h"
#include "ui/model/summary_editor.h"

namespace tendril {

// The frame `fraNumberEntry`, with one spin button or two. It floats over the window, opens beside the text that was
// pressed, and closes 3.5 s after the last change, or by Escape; the focus then goes back to the text.
class NumberEntry : public QFrame {
 public:
  // `editor` must outlive it; `changed` is called after each change of a record. `window` owns it.
  NumberEntry(SummaryEditor& editor, TimerFactory& timers,
              const std::function<void(std::size_t channel)>& changed, QWidget& window);

  // Opens beside `text`, which shows `field` of `channel`, 0 to 7.
  void OpenNumberEntry(std::size_t channel, SummaryField field, QWidget& text);
  // Closes it, if it is open.
  void Close();

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void ShowEntry();
  void OnAdjustDual();

  SummaryEditor& editor_;
  std::unique_ptr<Timer> tmrAdjustDual_;
  QPointer<QWidget> text_;  // beside which it is open
  QLabel* lblDisplay_;
  std::array<CalmSpinBox*, 2> spnSumValue_{};
  std::array<QLabel*, 2> lblSumValue_{};
};

}  // namespace tendril
