// RemarksLabel: remarks on the records, in words.
#pragma once

#include <QString>
#include <QStringList>
#include <string>
#include <vector>

#include "ui/announcement.h"

namespace tendril {

// Keeps the room for its lines while it is empty, so that nothing around it moves. New remarks are read out.
class RemarksLabel : public Announcement {
 public:
  RemarksLabel() { setAlignment(Qt::AlignLeft | Qt::AlignTop); }

  // Shows the first two of `sentences`, one to a line, or as many as it is high, and the number of the others. The tool
  // tip and the accessible name contain all of them.
  void ShowRemarks(const std::vector<std::string>& sentences);

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override { return {0, fontMetrics().lineSpacing()}; }

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void ShowLines();

  QStringList remarks_;
};

}  // namespace tendril
