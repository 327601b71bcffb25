#include <unistd.h>

#include <QSocketNotifier>

#include "app/typed_line.h"

namespace tendril {

// A terminal hands a line over when it is complete.
std::optional<QString> ReadTypedLine(ctl::Waiting& waiting, const ctl::StopRequest& stop) {
  bool readable = false;
  QSocketNotifier notifier(STDIN_FILENO, QSocketNotifier::Read);
  QObject::connect(&notifier, &QSocketNotifier::activated, &notifier, [&] {
    readable = true;
    notifier.setEnabled(false);
  });
  waiting.Until([&] { return readable || stop.Made(); });
  char line[256];
  const auto size = readable ? ::read(STDIN_FILENO, line, sizeof line) : -1;
  if (size <= 0) return std::nullopt;
  return QString::fromLocal8Bit(line, size).trimmed();
}

}  // namespace tendril
