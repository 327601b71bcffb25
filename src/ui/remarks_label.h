// RemarksLabel: remarks on the records and what differs from a unit, in words.
#pragma once

#include <QString>
#include <QStringList>
#include <string>
#include <vector>

#include "ui/announcement.h"

namespace tendril {

// Keeps the room for its lines while it is empty, so that nothing around it moves. New remarks are read out. The tool tip
// and the accessible name contain what has no room.
class RemarksLabel : public Announcement {
 public:
  RemarksLabel() { setAlignment(Qt::AlignLeft | Qt::AlignTop); }

  // Shows the first two of `sentences`, one to a line, or as many as it is high, and the number of the others.
  void ShowRemarks(const std::vector<std::string>& sentences);
  // Shows `lines` about what differs below the remarks, as many as there is room for, and the number of the others.
  // Cheap while they are the same.
  void ShowDifferences(const QStringList& lines);

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override { return {0, fontMetrics().lineSpacing()}; }

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void ShowWhole();
  void ShowLines();

  QStringList remarks_;
  QStringList differences_;
};

}  // namespace tendril
