// The time as the status bar shows it.
#pragma once

#include <QTime>
#include <string>

namespace tendril {

// Now: "14:02".
inline std::string TimeOfDay() {
  return QTime::currentTime().toString(QStringLiteral("HH:mm")).toStdString();
}

}  // namespace tendril
