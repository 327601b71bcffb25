#include <windows.h>

#include <QObject>
#include <memory>
#include <thread>

#include "app/typed_line.h"

namespace tendril {
namespace {

// Blocks until the line is complete; Ctrl+C, which is delivered besides, ends it.
std::optional<QString> ReadConsoleLine() {
  wchar_t line[256];
  DWORD size = 0;
  const BOOL read = ::ReadConsoleW(::GetStdHandle(STD_INPUT_HANDLE), line, 256, &size, nullptr);
  if (read == 0 || size == 0) return std::nullopt;
  return QString::fromWCharArray(line, static_cast<qsizetype>(size)).trimmed();
}

// What the thread that reads has in common with the one that waits.
struct Typed : QObject {
  bool ended = false;
  std::optional<QString> line;
};

}  // namespace

// After a stop the thread goes on to read until the process ends.
std::optional<QString> ReadTypedLine(ctl::Waiting& waiting, const ctl::StopRequest& stop) {
  const auto typed = std::shared_ptr<Typed>(new Typed, [](Typed* last) { last->deleteLater(); });
  std::thread([typed] {
    auto line = ReadConsoleLine();
    QMetaObject::invokeMethod(typed.get(), [to = typed.get(), line = std::move(line)] {
      to->line = line;
      to->ended = true;
    });
  }).detach();
  waiting.Until([&] { return typed->ended || stop.Made(); });
  return typed->line;
}

}  // namespace tendril
