// SummaryArea: all eight channels in one table.
#pragma once

#include <QAbstractButton>
#include <QButtonGroup>
#include <QGridLayout>
#include <QLabel>
#include <QLineEdit>
#include <QString>
#include <QWidget>
#include <array>
#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "platform/timer.h"
#include "ui/command_area.h"
#include "ui/model/summary_editor.h"
#include "ui/number_entry.h"
#include "ui/remarks_label.h"
#include "unitops/unit_commands.h"

namespace tendril {

// A header, a row for each channel and a trailer, in common columns, with the unit commands below. A value is changed
// by pressing on its text, or with Enter; a choice by its button.
class SummaryArea : public QWidget {
 public:
  // What only the window can carry out.
  struct Events {
    std::function<void()> back;                       // the simulator is wanted again
    std::function<void(std::size_t channel)> edited;  // the number entry has changed this channel's record
  };

  // `commands` and `working`, the records that are shown, must outlive the area; its buttons are added to `buttons`.
  SummaryArea(UnitCommands& commands, CommandButtons& buttons, TimerFactory& timers, ChannelTable& working,
              Events events, QWidget* parent = nullptr);

  // Start-up: what the range boxes read before the table is first shown.
  void SetRangeCaptions(const QString& caption);
  // Brings all records into their bounds, and shows them.
  void ShowRecords();
  // Shows what is to be said about the records.
  void ShowRemarks(const std::vector<std::string>& sentences) { remarks_->ShowRemarks(sentences); }
  // Gives the focus to the first value, where there is one.
  void TakeFocus();
  // Closes the number entry, if it is open.
  void CloseNumberEntry() { entry_->Close(); }

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  static constexpr std::size_t kFields = 5;

  struct Row {
    std::array<QLineEdit*, kFields> texts{};
    std::vector<QAbstractButton*> options;
    QButtonGroup* power_up = nullptr;  // the buttons' ids are the record's values
    QButtonGroup* lost_comm = nullptr;
    QLabel* lblSumDIOPWM = nullptr;
  };

  void AddHeader(QGridLayout& table);
  void AddRow(QGridLayout& table, int channel);
  void AddOptions(QGridLayout& table, int channel, const QString& name);
  void AddTrailer(QGridLayout& table);
  QLayout* MakeButtons(UnitCommands& commands, CommandButtons& buttons);
  void ShowRow(std::size_t channel);
  void ShowTexts(std::size_t channel);

  ChannelTable& working_;
  SummaryEditor editor_;
  Events events_;
  std::array<Row, kPortCount> rows_;
  NumberEntry* entry_;
  RemarksLabel* remarks_ = nullptr;
};

}  // namespace tendril
