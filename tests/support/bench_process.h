// BenchProcess: a tendril-bench in a process of its own, and the folder in which the program finds its
// device.
#pragma once
#ifdef _WIN32
#include "support/wine_bench_process.h"
#else

#include <QByteArray>
#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QHostAddress>
#include <QProcess>
#include <QString>
#include <QStringList>
#include <QTcpServer>
#include <QTemporaryDir>
#include <QThread>
#include <filesystem>
#include <stdexcept>
#include <string>

namespace tendril::test {

// The bench's device is Comm 1 of this process for as long as the object lasts: the configuration folder is a
// temporary one. TENDRIL_BENCH_PROGRAM names the program.
class BenchProcess {
 public:
  BenchProcess() {
    qputenv("XDG_CONFIG_HOME", folder_.path().toUtf8());
    qputenv("XDG_STATE_HOME", folder_.path().toUtf8());
    QDir(folder_.path()).mkpath(QStringLiteral("kelvane/ports"));
    LinkToNowhere();
  }
  ~BenchProcess() { Kill(); }

  // Starts the bench and waits until its device is there. `printing`: it prints what crosses the line.
  void Start(const QStringList& options = {}, bool printing = false) {
    process_.setStandardOutputFile(folder_.filePath(QStringLiteral("bench.txt")));
    const QStringList quiet = printing ? QStringList() : QStringList{QStringLiteral("--quiet")};
    process_.start(QStringLiteral(TENDRIL_BENCH_PROGRAM), quiet + options);
    const QDeadlineTimer deadline(10000);
    while (!QFileInfo::exists(Link())) {
      if (deadline.hasExpired()) throw std::runtime_error("tendril-bench does not start");
      QCoreApplication::processEvents();  // a program in this process goes on
      QThread::msleep(2);
    }
  }
  // Unplugs: the device is gone at once.
  void Kill() {
    process_.kill();
    process_.waitForFinished();
    LinkToNowhere();  // the name of a device that is gone is given to the next one
  }
  // What it has printed so far.
  std::string Printed() const {
    QFile file(folder_.filePath(QStringLiteral("bench.txt")));
    return file.open(QIODevice::ReadOnly) ? file.readAll().toStdString() : std::string();
  }
  // Gives this process a registry, as its editor exports it, with a comm listener's TCP port where nothing
  // listens yet. Returns the port, for "--control-panel".
  QString WriteRegistry() {
    QTcpServer finder;
    if (!finder.listen(QHostAddress::LocalHost)) throw std::runtime_error("there is no free TCP port");
    QFile file(folder_.filePath(QStringLiteral("kelvane/registry.reg")));
    if (!file.open(QIODevice::WriteOnly)) throw std::runtime_error("the registry cannot be written");
    file.write(
        "Windows Registry Editor Version 5.00\r\n\r\n"
        "[HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\NetVersion]\r\n\"Ver\"=\"2\"\r\n\r\n"
        "[HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\Network2]\r\n\"DMXListenerPort\"=dword:" +
        QByteArray::number(finder.serverPort(), 16).rightJustified(8, '0') + "\r\n");
    return QString::number(finder.serverPort());
  }
  // Its process, while it runs.
  qint64 ProcessId() const { return process_.processId(); }
  // The path of the link to the device.
  QString Link() const { return folder_.filePath(QStringLiteral("kelvane/ports/com1")); }

 private:
  // Without a link, Comm 1 would be a serial port of the machine that the test runs on, if only for a moment.
  void LinkToNowhere() const {
    const std::filesystem::path link = Link().toStdString(), beside = link.string() + ".new";
    std::filesystem::create_symlink("/nowhere", beside);
    std::filesystem::rename(beside, link);
  }

  QTemporaryDir folder_;
  QProcess process_;
};

}  // namespace tendril::test
#endif
