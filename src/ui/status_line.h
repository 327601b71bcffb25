// StatusLine: the window's status bar.
#pragma once

#include <QStatusBar>
#include <QString>

#include "ui/announcement.h"

namespace tendril {

// Shows one sentence until the next one. The mouse can select it.
class StatusLine : public QStatusBar {
 public:
  StatusLine();

  // Shows `sentence`, and has it read out.
  void Say(const QString& sentence);
  // Puts the sentence on the clipboard.
  void Copy() const;

 private:
  Announcement* lblStatus_;
};

}  // namespace tendril
