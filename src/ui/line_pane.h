// LinePane: the pane that shows what crosses the line.
#pragma once

#include <QAbstractButton>
#include <QCheckBox>
#include <QDockWidget>
#include <QLayout>
#include <QPointer>
#include <QPushButton>
#include <QString>
#include <QTableView>
#include <memory>
#include <optional>

#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "trace/line_trace.h"
#include "trace/line_verdict.h"
#include "ui/announcement.h"
#include "ui/program_info.h"
#include "ui/sign.h"
#include "ui/trace_model.h"
#include "unitops/unit_target.h"

namespace tendril {

// The verdict about the line, and below it the trace. It follows the trace while its end is shown: at most ten times a
// second, and only when the trace has changed. Costs nothing while it is hidden.
class LinePane : public QDockWidget {
  Q_OBJECT

 public:
  // All must outlive its use. The pane is the only one that `trace` reports its changes to. `window` owns it.
  LinePane(LineTrace& trace, TimerFactory& timers, const HwSerial& link, const UnitTarget& target,
           const ProgramInfo& info, QWidget& window);

  // Shows the pane, with the focus in its table. When it closes, the focus goes back.
  void Open();
  // Puts the report for support on the clipboard, also while the pane is hidden.
  void CopyReport();

 Q_SIGNALS:
  // For the status bar.
  void Said(const QString& sentence);

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void showEvent(QShowEvent* event) override;
  void hideEvent(QHideEvent* event) override;

 private:
  void SetUpTable();
  QLayout* MakeHeader();
  void OnChanged();
  void Update();
  void KeepRoomForVerdict();
  void ShowVerdict();
  void ShowWaiting();
  void Pause(bool paused);
  void Clear();
  void Follow(bool follow);
  void OnScrolled(int value);
  void OnScrollRange(int last);

  LineTrace& trace_;
  const HwSerial& link_;
  const UnitTarget& target_;
  const ProgramInfo& info_;
  TraceModel model_;
  std::optional<LineVerdict> verdict_;
  bool updating_ = false;  // the table scrolls by itself
  QPointer<QWidget> focus_before_;

  // Owned by the pane, as its child widgets.
  Sign* sign_;
  Announcement* lblVerdict_;
  QCheckBox* chkFollow_;  // a pressed button does not stand out on dark
  QCheckBox* chkPause_;
  QPushButton* cmdClear_;
  QPushButton* cmdCopy_;
  QTableView* lines_;

  std::unique_ptr<Timer> tmrUpdate_;
};

}  // namespace tendril
