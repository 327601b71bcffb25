// CtlProcess: the program tendril-ctl in a process of its own.
#pragma once

#include <QByteArray>
#include <QProcess>
#include <QString>
#include <QStringList>
#include <csignal>
#include <string>

#include "platform/wait_for.h"

namespace tendril::test {

// TENDRIL_CTL_PROGRAM names the program; TENDRIL_CTL in the environment another one, such as the installed one.
class CtlProcess {
 public:
#ifdef _WIN32
  explicit CtlProcess(const QStringList& arguments, const char* /*redirection*/ = nullptr) {
    process_.start(qEnvironmentVariable("TENDRIL_CTL", QStringLiteral(TENDRIL_CTL_PROGRAM)), arguments);
    process_.closeWriteChannel();
  }
#else
  // `redirection`: what a shell does before it becomes the program: "ulimit -f 0", "exec >/dev/full".
  explicit CtlProcess(const QStringList& arguments, const char* redirection = "true") {
    process_.start(QStringLiteral("/bin/sh"),
                   QStringList{QStringLiteral("-c"),
                               QString::fromUtf8(redirection) + QStringLiteral(" && exec \"$0\" \"$@\""),
                               qEnvironmentVariable("TENDRIL_CTL", QStringLiteral(TENDRIL_CTL_PROGRAM))} +
                       arguments);
    process_.closeWriteChannel();
  }
  void Signal(int number) const { ::kill(static_cast<pid_t>(process_.processId()), number); }
#endif
  ~CtlProcess() {
    process_.kill();
    process_.waitForFinished();
  }

  // Waits until standard error has this text.
  bool WaitFor(const char* text) {
    return test::WaitFor([&] { return Error().find(text) != std::string::npos || HasEnded(); }) &&
           Error().find(text) != std::string::npos;
  }
  // Waits for its end and returns its exit code; -1 when it crashed or does not end.
  int ExitCode() {
    constexpr int kLongestMs = 60'000;
    if (!test::WaitFor([this] { return HasEnded(); }, kLongestMs)) return -1;
    return process_.exitStatus() == QProcess::NormalExit ? process_.exitCode() : -1;
  }
  // What it has printed so far.
  const std::string& Out() {
    out_ += process_.readAllStandardOutput().toStdString();
    return out_;
  }
  const std::string& Error() {
    error_ += process_.readAllStandardError().toStdString();
    return error_;
  }

 private:
  bool HasEnded() const { return process_.state() == QProcess::NotRunning; }

  QProcess process_;
  std::string out_;
  std::string error_;
};

}  // namespace tendril::test
