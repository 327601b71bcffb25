// NumberEntry: the panel that changes a value of the summary.
#pragma once

#include <QLabel>
#include <QPointer>
#include <array>
#include <cstddef>
#include <memory>

#include "platform/timer.h"
#include "ui/controls.h"
#include "ui/model/summary_editor.h"

namespace tendril {

// The frame `fraNumberEntry`, with one spin button or two. Opens beside the text that was pressed. Closes 3.5 s after
// the last change, or on Escape, and gives the focus back to the text.
class NumberEntry : public PopUp {
  Q_OBJECT

 public:
  // `editor` must outlive the panel. `window` owns it.
  NumberEntry(SummaryEditor& editor, TimerFactory& timers, QWidget& window);

  // Opens beside `text`, which shows `field` of `channel`, 0 to 7.
  void OpenNumberEntry(std::size_t channel, SummaryField field, QWidget& text);
  // Closes the panel if it is open.
  void Close();

 Q_SIGNALS:
  // The record of `channel` was changed.
  void Changed(std::size_t channel);

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void OnSpin(std::size_t index, int value);
  void ShowEntry();
  void OnAdjustDual();

  SummaryEditor& editor_;
  std::unique_ptr<Timer> tmrAdjustDual_;
  QPointer<QWidget> text_;  // the text that it is open beside
  QLabel* lblDisplay_;
  std::array<CalmSpinBox*, 2> spnSumValue_{};
  std::array<QLabel*, 2> lblSumValue_{};
};

}  // namespace tendril
