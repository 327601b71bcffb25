// NumberEntry: the panel that changes a value of the summary.
#pragma once

#include <QLabel>
#include <QPointer>
#include <array>
#include <cstddef>
#include <memory>

#include "platform/timer.h"
#include "ui/calm_spin_box.h"
#include "ui/controls.h"
#include "ui/model/summary_editor.h"
#include "ui/notice_label.h"

namespace tendril {

// The frame `fraNumberEntry`, with one spin button or two. Opens beside the text that was pressed. Closes 3.5 s after
// the last change, or on Escape, and gives the focus back to the text. Escape drops what is typed.
class NumberEntry : public PopUp {
  Q_OBJECT

 public:
  // `editor` must outlive the panel. `window` owns it.
  NumberEntry(SummaryEditor& editor, TimerFactory& timers, QWidget& window);

  // Opens beside `text`, which shows `field` of `channel`, 0 to 7.
  void OpenNumberEntry(std::size_t channel, SummaryField field, QWidget& text);
  // Closes the panel, and drops what is typed. False: it is not open.
  bool Close();
  // The same, but what is typed takes effect.
  void Leave();
  // Whether the change that is reported just now goes on with the one before.
  bool Repeats() const;

 Q_SIGNALS:
  // The record of `channel` was changed.
  void Changed(std::size_t channel);
  // A typed number cannot be taken; see CalmSpinBox.
  void NumberDropped(const QString& typed, const QString& sentence);

 protected:
  bool eventFilter(QObject* spin, QEvent* event) override;

 private:
  CalmSpinBox* MakeSpin(std::size_t index);
  void OnSpin(std::size_t index, int value);
  void ShowEntry();
  void OnAdjustDual();

  SummaryEditor& editor_;
  std::unique_ptr<Timer> tmrAdjustDual_;
  QPointer<QWidget> text_;  // the text that it is open beside
  QLabel* lblDisplay_;
  std::array<CalmSpinBox*, 2> spnSumValue_{};
  std::array<QLabel*, 2> lblSumValue_{};
  NoticeLabel* typed_;
};

}  // namespace tendril
