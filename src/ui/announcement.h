// Announcement: a label that speaks.
#pragma once

#include <QLabel>
#include <QString>

namespace tendril {

// A label that assistive technology reads out wherever the focus is, once for each Announce(). It is a notification
// that appears: Qt passes no alert on to Linux, and Windows plays a sound for one. While there is nothing to read the
// label is hidden, and keeps its place.
class Announcement : public QLabel {
  Q_OBJECT

 public:
  Announcement();

  // Has `sentence` read out. It is the accessible name from now on; what the label shows does not change. Empty: hides
  // the label.
  void Announce(const QString& sentence);
};

}  // namespace tendril
