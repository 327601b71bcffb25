// SummaryArea: all eight channels in one table.
#pragma once

#include <QButtonGroup>
#include <QGridLayout>
#include <QLabel>
#include <QPushButton>
#include <QString>
#include <QWidget>
#include <array>
#include <cstddef>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "platform/timer.h"
#include "ui/model/comparison.h"
#include "ui/model/summary_editor.h"
#include "ui/number_entry.h"
#include "ui/remarks_label.h"
#include "ui/summary_row_frame.h"

namespace tendril {

// A header, a row for each channel and a trailer, in common columns, with unit commands below. A press on a value, or
// Enter, opens the number entry; the choices are radio buttons.
class SummaryArea : public QWidget {
  Q_OBJECT

 public:
  // `working` are the records that are shown, and `comparison` compares. Both must outlive the area. `parent` is in the
  // window already, which owns the number entry.
  SummaryArea(TimerFactory& timers, ChannelTable& working, const Comparison& comparison, QWidget* parent);

  // Shows all records as they are.
  void ShowRecords();
  // Brings all records into their bounds, and shows them.
  void NormaliseAndShowRecords();
  // Signs what differs from the unit that is compared, and says it in words. What shows records does it, too.
  void ShowDifferences();
  // Shows remarks on the records.
  void ShowRemarks(const std::vector<std::string>& sentences) { remarks_->ShowRemarks(sentences); }
  // Enables the unit commands, and what changes records. `running_command` is what runs; empty when nothing does.
  void EnableControls(const QString& running_command);
  // The table with its captions, separated by tabs: each number in a column of its own.
  QString TableText() const;
  // Gives the focus to the first value, if there is one.
  void TakeFocus();
  // Closes the number entry. False: it is not open.
  bool CloseNumberEntry() { return entry_->Close(); }
  // Whether the change that is reported just now goes on with the one before.
  bool Repeats() const { return entry_->Repeats(); }

 Q_SIGNALS:
  void SendPressed();
  void GetPressed();
  void ComparePressed();
  void SimulatorPressed();
  // The number entry has changed this channel's record.
  void Edited(std::size_t channel);
  // The user chose an option; the record holds it.
  void OptionChosen();
  // A number typed into the number entry cannot be taken; see CalmSpinBox.
  void NumberDropped(const QString& typed, const QString& sentence);

 private:
  static constexpr std::size_t kTexts = 5;

  struct Row {
    SummaryRowFrame* frame = nullptr;
    QLabel* lblSumChannel = nullptr;
    std::array<PressableText*, kTexts> texts{};
    QButtonGroup* power_up = nullptr;  // the buttons' ids are the record's values
    QButtonGroup* lost_comm = nullptr;
    QLabel* lblSumDIOPWM = nullptr;
  };

  QLayout* MakeButtons();
  void AddHeader(QGridLayout& table);
  void AddRow(QGridLayout& table, std::size_t channel);
  void AddOptions(QGridLayout& table, std::size_t channel, const QString& name);
  void AddTrailer(QGridLayout& table);
  void ShowRow(std::size_t channel);
  void ShowTexts(std::size_t channel);
  void ShowDifferences(std::size_t channel);
  void ShowDifferencesInWords();

  ChannelTable& working_;
  const Comparison& comparison_;
  SummaryEditor editor_;
  NumberEntry* entry_ = nullptr;
  std::array<Row, kPortCount> rows_;
  QPushButton* cmdSend_ = nullptr;
  QPushButton* cmdGet_ = nullptr;
  QPushButton* cmdCompare_ = nullptr;
  RemarksLabel* remarks_ = nullptr;
};

}  // namespace tendril
