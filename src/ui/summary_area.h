// SummaryArea: all eight channels in one table.
#pragma once

#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>
#include <QWidget>
#include <vector>

#include "ui/command_area.h"
#include "unitops/unit_commands.h"

namespace tendril {

// A header, a row for each channel and a trailer, in common columns, with the unit commands below.
class SummaryArea : public QWidget {
 public:
  // `commands` must outlive the area; its buttons are added to `buttons`.
  SummaryArea(UnitCommands& commands, CommandButtons& buttons, QWidget* parent = nullptr);

  // Start-up: what the range boxes read before the table is first shown.
  void SetRangeCaptions(const QString& caption);

 private:
  QWidget* MakeHeader();
  QWidget* MakeRow(int channel);
  QWidget* MakeTrailer();
  QLayout* MakeButtons(UnitCommands& commands, CommandButtons& buttons);
  void MakeNumberEntry();

  std::vector<QLineEdit*> range_boxes_;
};

}  // namespace tendril
