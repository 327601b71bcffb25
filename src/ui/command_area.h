// CommandArea: the unit commands, and the buttons that switch the view.
#pragma once

#include <QPushButton>
#include <QString>
#include <QWidget>
#include <cstdint>

namespace tendril {

// The tool tips of the commands that the summary has too.
inline constexpr char kSendTip[] = "Writes the configuration of all eight ports into the chosen unit.";
inline constexpr char kGetTip[] = "Reads the configuration of all eight ports out of the chosen unit.";
inline constexpr char kCompareTip[] =
    "Reads the chosen unit, and signs what differs from the records here. It changes no record.";

class CommandArea : public QWidget {
  Q_OBJECT

 public:
  CommandArea();

  // Enables the unit commands, and "Summary" while the summary is not shown. `running_command` is what runs; empty when
  // nothing does. `unit_id` is the chosen one.
  void EnableCommands(const QString& running_command, std::uint8_t unit_id, bool summary_shown);

 Q_SIGNALS:
  void SendPressed();
  void GetPressed();
  void ComparePressed();
  void ChangeIdPressed();
  void SummaryPressed();

 private:
  QPushButton* cmdSend_;
  QPushButton* cmdGet_;
  QPushButton* cmdCompare_;
  QPushButton* cmdChangeId_;
  QPushButton* cmdShowSummary_;
};

}  // namespace tendril
