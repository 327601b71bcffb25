// BenchProcess: a tendril-bench in a process of its own, and the folder in which the program finds its
// device.
#pragma once

#include <QByteArray>
#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcess>
#include <QString>
#include <QStringList>
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
  }
  ~BenchProcess() { Kill(); }

  // Starts the bench and waits until its device is there. `printing`: it says what crosses the line.
  void Start(const QStringList& options = {}, bool printing = false) {
    // The link of one that was killed; its device's name may belong to somebody else by now.
    std::filesystem::remove(Link().toStdString());
    process_.setStandardOutputFile(folder_.filePath(QStringLiteral("bench.txt")));
    const QStringList quiet = printing ? QStringList() : QStringList{QStringLiteral("--quiet")};
    process_.start(QStringLiteral(TENDRIL_BENCH_PROGRAM), quiet + options);
    const QDeadlineTimer deadline(10000);
    while (!QFileInfo::exists(Link())) {
      if (deadline.hasExpired()) throw std::runtime_error("tendril-bench does not start");
      QThread::msleep(5);
    }
  }
  // Pulls the plug: the device is gone at once. Its link stays and leads nowhere, so that Comm 1 never
  // becomes a serial port of the machine that the test runs on.
  void Kill() {
    process_.kill();
    process_.waitForFinished();
  }
  // What it has printed so far.
  std::string Printed() const {
    QFile file(folder_.filePath(QStringLiteral("bench.txt")));
    return file.open(QIODevice::ReadOnly) ? file.readAll().toStdString() : std::string();
  }
  // Makes `bytes` the registry of this process.
  void WriteRegistry(const QByteArray& bytes) {
    QDir(folder_.path()).mkpath(QStringLiteral("kelvane"));
    QFile file(folder_.filePath(QStringLiteral("kelvane/registry.reg")));
    if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size()) {
      throw std::runtime_error("the registry cannot be written");
    }
  }
  // Where the link to the device stands.
  QString Link() const { return folder_.filePath(QStringLiteral("kelvane/ports/com1")); }

 private:
  QTemporaryDir folder_;
  QProcess process_;
};

}  // namespace tendril::test
