// BenchProcess for tests for Windows, under wine: the bench is a program of Linux.
#pragma once

#include <QByteArray>
#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QFile>
#include <QHostAddress>
#include <QProcess>
#include <QSettings>
#include <QString>
#include <QStringList>
#include <QTcpServer>
#include <QTemporaryDir>
#include <QThread>
#include <functional>
#include <stdexcept>
#include <string>

#include "platform/process_list.h"

namespace tendril::test {

// As bench_process.h has it. Wine starts programs of Linux but has no handle for them: a shell starts the bench, and
// another one ends it. Its device is COM1 of the emulator; TENDRIL_PORT_NOTES names the file of wine_modem_lines.cpp.
class BenchProcess {
 public:
  BenchProcess() { Shared().remove(QString()); }
  ~BenchProcess() {
    Kill();
    Shared().remove(QString());
  }

  void Start(const QStringList& options = {}, bool printing = false) {
    QFile::remove(folder_.filePath(QStringLiteral("bench.txt")));
    const QStringList quiet = printing ? QStringList() : QStringList{QStringLiteral("--quiet")};
    Run("unset LD_PRELOAD && cd \"$0\" && { \"$@\" >bench.txt & } && echo $! >process && wait;"
        "ln -s /nowhere nowhere && mv -T nowhere \"$3\" && rm process",
        QStringList{folder_.path().mid(2), QStringLiteral(TENDRIL_BENCH_PROGRAM), QStringLiteral("--link"),
                    qEnvironmentVariable("WINEPREFIX") + QStringLiteral("/dosdevices/com1")} +
            quiet + options);
    if (options.contains(QLatin1String("--control-panel"))) {
      // Windows programs do not see the bench's name in the list of processes. This one waits for input.
      const QString panel = folder_.filePath(QString::fromUtf8(kControlPanelProgram));
      QFile::copy(QStringLiteral("C:/windows/system32/cmd.exe"), panel);
      panel_.start(panel);
      panel_.waitForStarted();
    }
    Await([this] { return ProcessId() != 0 && Printed().find("ends the bench.") != std::string::npos; });
  }
  void Kill() {
    if (ProcessId() == 0) return;
    Run("kill -9 $0", {QString::number(ProcessId())});
    Await([this] { return ProcessId() == 0; });
    panel_.kill();
    panel_.waitForFinished();
  }
  std::string Printed() const { return Content("bench.txt").toStdString(); }
  QString WriteRegistry() {
    QTcpServer finder;
    if (!finder.listen(QHostAddress::LocalHost)) throw std::runtime_error("there is no free TCP port");
    QSettings shared = Shared();
    shared.setValue(QStringLiteral("NetVersion/Ver"), QStringLiteral("2"));
    shared.setValue(QStringLiteral("Network2/DMXListenerPort"), int{finder.serverPort()});
    return QString::number(finder.serverPort());
  }
  qint64 ProcessId() const { return Content("process").trimmed().toLongLong(); }

 private:
  static QSettings Shared() {
    return QSettings(QStringLiteral("HKEY_CURRENT_USER\\Software\\Kelvane\\Shared"), QSettings::NativeFormat);
  }
  static void Run(const char* line, const QStringList& arguments) {
    QProcess::startDetached(QStringLiteral("\\\\?\\unix\\bin\\sh"),
                            QStringList{QStringLiteral("-c"), QString::fromUtf8(line)} + arguments);
  }
  // A program in this process goes on meanwhile.
  static void Await(const std::function<bool()>& done) {
    const QDeadlineTimer deadline(10000);
    while (!done()) {
      if (deadline.hasExpired()) throw std::runtime_error("tendril-bench does not start or does not end");
      QCoreApplication::processEvents();
      QThread::msleep(2);
    }
  }
  QByteArray Content(const char* name) const {
    QFile file(folder_.filePath(QString::fromUtf8(name)));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
  }

  QTemporaryDir folder_{QStringLiteral("Z:/tmp/tendril-bench-XXXXXX")};  // drive Z has the files of Linux
  QProcess panel_;
};

}  // namespace tendril::test
