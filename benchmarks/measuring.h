// What the programs that measure have in common.
#pragma once

#include <QElapsedTimer>
#include <algorithm>
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

}  // namespace tendril
