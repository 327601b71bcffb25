// SummaryArea: all eight channels in one table.
#pragma once

#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>
#include <QWidget>
#include <vector>

namespace tendril {

// A header, a row for each channel and a trailer, in common columns, with the unit commands below.
class SummaryArea : public QWidget {
 public:
  explicit SummaryArea(QWidget* parent = nullptr);

  // Start-up: what the range boxes read before the table is first shown.
  void SetRangeCaptions(const QString& caption);

 private:
  QWidget* MakeHeader();
  QWidget* MakeRow(int channel);
  QWidget* MakeTrailer();

  std::vector<QLineEdit*> range_boxes_;
};

}  // namespace tendril
