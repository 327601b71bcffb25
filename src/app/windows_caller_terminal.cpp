#include <windows.h>

#include <QApplication>
#include <QFontDatabase>
#include <QMessageBox>

#include "app/caller_terminal.h"

namespace tendril {
namespace {

DWORD NumberOf(Stream stream) { return stream == Stream::kError ? STD_ERROR_HANDLE : STD_OUTPUT_HANDLE; }

// The console of the process that has started this one. Its prompt may stand there already.
class CallerConsole {
 public:
  explicit CallerConsole(Stream stream)
      : stream_(stream),
        before_(::GetStdHandle(NumberOf(stream))),
        attached_(::AttachConsole(ATTACH_PARENT_PROCESS)) {
    console_ = ::CreateFileW(L"CONOUT$", GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE,
                             nullptr, OPEN_EXISTING, 0, nullptr);
    ::SetStdHandle(NumberOf(stream_), console_);
  }
  ~CallerConsole() {
    ::SetStdHandle(NumberOf(stream_), before_);
    ::CloseHandle(console_);
    if (attached_ != 0) ::FreeConsole();  // what happens to it is nothing to this process
  }
  CallerConsole(const CallerConsole&) = delete;
  CallerConsole& operator=(const CallerConsole&) = delete;

  bool Print(const QString& text) const {
    CONSOLE_SCREEN_BUFFER_INFO about = {};
    if (::GetConsoleScreenBufferInfo(console_, &about) == 0) return false;
    return !WriteAll(stream_, (about.dwCursorPosition.X != 0 ? "\n" : "") + text.toStdString());
  }

 private:
  Stream stream_;
  HANDLE before_;
  BOOL attached_;
  HANDLE console_ = nullptr;
};

void ShowInBox(Stream stream, const QString& text) {
  QMessageBox box(stream == Stream::kError ? QMessageBox::Critical : QMessageBox::Information,
                  QStringLiteral("Tendril Configuration Utility"), text.trimmed(), QMessageBox::Ok);
  box.setTextFormat(Qt::PlainText);
  box.setFont(QFontDatabase::systemFont(QFontDatabase::FixedFont));
  box.exec();
}

}  // namespace

void ShowInTerminal(Stream stream, const QString& text) {
  const DWORD kind = ::GetFileType(::GetStdHandle(NumberOf(stream)));
  const bool redirected = kind == FILE_TYPE_DISK || kind == FILE_TYPE_PIPE;
  if (redirected && !WriteAll(stream, text.toStdString())) return;
  if (!CallerConsole(stream).Print(text)) ShowInBox(stream, text);
}

}  // namespace tendril
