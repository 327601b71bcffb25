// The time as the window shows and keeps it.
#pragma once

#include <QDateTime>
#include <string>

namespace tendril {

// Now: "14:02".
inline std::string TimeOfDay() {
  return QTime::currentTime().toString(QStringLiteral("HH:mm")).toStdString();
}

// Now, with the date and the offset from UTC: "2026-11-22T14:02:31+01:00".
inline std::string IsoTime() {
  const QDateTime now = QDateTime::currentDateTime();
  return now.toOffsetFromUtc(now.offsetFromUtc()).toString(Qt::ISODate).toStdString();
}

}  // namespace tendril
