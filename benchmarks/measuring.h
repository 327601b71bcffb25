// What the programs that measure have in common.
#pragma once

#include <unistd.h>

#include <QApplication>
#include <QElapsedTimer>
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <fstream>
#include <vector>

namespace tendril {

// Steady, and of high resolution. Runs from its construction.
class Stopwatch {
 public:
  Stopwatch() { timer_.start(); }
  double Ms() const { return static_cast<double>(timer_.nsecsElapsed()) / 1e6; }

 private:
  QElapsedTimer timer_;
};

// Of a copy, which is sorted. There must be a value.
inline double Median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values.at(values.size() / 2);
}

// Resident memory of this process. Linux only.
inline double ResidentBytes() {
  double pages = 0, resident = 0;
  std::ifstream("/proc/self/statm") >> pages >> resident;
  return resident * static_cast<double>(::sysconf(_SC_PAGESIZE));
}

// The main function of a benchmark, offscreen unless the environment names another platform. `measure` prints each
// figure with its bound, and returns whether all are within their bounds; so does the exit code.
inline int RunBenchmark(int argc, char** argv, bool (*measure)()) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  const QApplication application(argc, argv);
  try {
    return measure() ? EXIT_SUCCESS : EXIT_FAILURE;
  } catch (const std::exception& fault) {
    std::printf("%s\n", fault.what());
    return EXIT_FAILURE;
  }
}

}  // namespace tendril
