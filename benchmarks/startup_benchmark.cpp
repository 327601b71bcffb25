// How long the program takes from its start to its first painted window, and how much memory it holds then,
// against an empty Qt window, and against one of as many plain controls. Each run is a process of its own; the kinds
// take turns.
#include <QCoreApplication>
#include <QDir>
#include <QProcess>
#include <QStringList>
#include <QTemporaryDir>
#include <cstddef>
#include <cstdio>
#include <stdexcept>
#include <string>
#include <vector>

#include "measuring.h"
#include "plain_controls.h"

namespace tendril {
namespace {

constexpr int kRuns = 25;

struct Measure {
  std::vector<double> ms, mib;
};

// The most that the program may take, as a multiple of another program.
struct Bounds {
  const char* other;
  double start, memory;
};
// The first is the target. What Qt itself takes for the controls is beyond it already, so the second decides.
constexpr Bounds kAgainstEmpty{"empty window", 1.5, 1.5};
constexpr Bounds kAgainstPlain{"window of plain controls", 1.35, 1.2};

QString PathOf(const char* program) {
  return QDir(QCoreApplication::applicationDirPath()).filePath(QString::fromLatin1(program));
}

// How many controls the program's window has, as arguments of plain_window.
QStringList CountControls() {
  QProcess child;
  child.start(PathOf("first_window"), {QStringLiteral("--count")});
  child.waitForFinished();
  return QString::fromLatin1(child.readAllStandardOutput()).split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

void RunOnce(const char* program, Measure& measure, const QStringList& arguments = {}) {
  QProcess child;
  const Stopwatch stopwatch;
  child.start(PathOf(program), arguments);
  if (!child.waitForReadyRead(20000)) {
    throw std::runtime_error(std::string(program) + " does not paint its window");
  }
  measure.ms.push_back(stopwatch.Ms());
  measure.mib.push_back(child.readAllStandardOutput().trimmed().toDouble());
  child.waitForFinished();
}

bool Report(const char* what, const char* unit, const std::vector<double>& program, const char* other_what,
            const std::vector<double>& other, double max_ratio) {
  const double ratio = Median(program) / Median(other);
  std::printf("%s, median of %d: program %.1f %s, %s %.1f %s, ratio %.2f (at most %.2f)\n", what, kRuns,
              Median(program), unit, other_what, Median(other), unit, ratio, max_ratio);
  return ratio <= max_ratio;
}

bool ReportBoth(const Measure& program, const Measure& other, const Bounds& bounds) {
  const bool fast =
      Report("start to first painted window", "ms", program.ms, bounds.other, other.ms, bounds.start);
  const bool small = Report("resident memory", "MiB", program.mib, bounds.other, other.mib, bounds.memory);
  return fast && small;
}

bool MeasureAll() {
  const QTemporaryDir folder;  // no port of this machine is looked at
  qputenv("XDG_CONFIG_HOME", folder.path().toUtf8());

  const QStringList counts = CountControls();
  std::printf("the window of plain controls has");
  for (std::size_t kind = 0; kind < kPlainKinds.size(); ++kind)
    std::printf(" %s %s,", qPrintable(counts.value(static_cast<qsizetype>(kind))), kPlainKinds[kind].name);
  std::printf(" menus and actions: %s\n", qPrintable(counts.mid(kPlainKinds.size()).join(QLatin1Char(' '))));

  Measure program, empty, plain;
  for (int run = 0; run < kRuns + 1; ++run) {
    RunOnce("empty_window", empty);
    RunOnce("plain_window", plain, counts);
    RunOnce("first_window", program);
    if (run == 0) program = empty = plain = {};  // the first round warms the caches
  }
  if (!ReportBoth(program, empty, kAgainstEmpty))
    std::printf("  the target against an empty window is MISSED\n");
  return ReportBoth(program, plain, kAgainstPlain);
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::MeasureAll); }
