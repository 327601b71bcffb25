// How long the program takes from its start to its first painted window, and how much memory it holds then,
// against an empty Qt window. Each run is a process of its own; the two kinds take turns.
#include <QCoreApplication>
#include <QDir>
#include <QProcess>
#include <QTemporaryDir>
#include <cstdio>
#include <cstdlib>
#include <vector>

#include "measuring.h"

namespace {

using tendril::Median;

constexpr int kRuns = 25;
constexpr double kMaxRatio = 1.5;

struct Measure {
  std::vector<double> ms, mib;
};

void RunOnce(const char* program, Measure& measure) {
  const QString path = QDir(QCoreApplication::applicationDirPath()).filePath(QString::fromLatin1(program));
  QProcess child;
  const tendril::Stopwatch stopwatch;
  child.start(path, QStringList());
  if (!child.waitForReadyRead(20000)) {
    std::printf("%s does not paint its window\n", program);
    std::exit(EXIT_FAILURE);
  }
  measure.ms.push_back(stopwatch.Ms());
  measure.mib.push_back(child.readAllStandardOutput().trimmed().toDouble() / 1024);
  child.waitForFinished();
}

bool Report(const char* what, const char* unit, double program, double empty) {
  const double ratio = program / empty;
  std::printf("%s, median of %d: program %.1f %s, empty window %.1f %s, ratio %.2f (at most %.1f)\n", what,
              kRuns, program, unit, empty, unit, ratio, kMaxRatio);
  return ratio <= kMaxRatio;
}

}  // namespace

int main(int argc, char** argv) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  QCoreApplication application(argc, argv);
  const QTemporaryDir folder;  // no port of this machine is looked at
  qputenv("XDG_CONFIG_HOME", folder.path().toUtf8());

  Measure program;
  Measure empty;
  for (int run = 0; run < kRuns + 1; ++run) {
    RunOnce("empty_window", empty);
    RunOnce("first_window", program);
    if (run == 0) program = empty = {};  // the first pair warms the caches
  }
  const bool fast = Report("start to first painted window", "ms", Median(program.ms), Median(empty.ms));
  const bool small = Report("resident memory", "MiB", Median(program.mib), Median(empty.mib));
  return fast && small ? EXIT_SUCCESS : EXIT_FAILURE;
}
