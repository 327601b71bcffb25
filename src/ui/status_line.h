// StatusLine: the window's status bar.
#pragma once

#include <QLabel>
#include <QStatusBar>
#include <QString>

namespace tendril {

// Shows one sentence until the next one.
class StatusLine : public QStatusBar {
 public:
  StatusLine();

  void Say(const QString& sentence);

 private:
  QLabel* lblStatus_;
};

}  // namespace tendril
