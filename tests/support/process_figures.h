// What this process holds and uses, as the system counts it. Linux only.
#pragma once

#include <malloc.h>
#include <unistd.h>

#include <QEventLoop>
#include <QTimer>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <iterator>

namespace tendril::test {

struct Held {
  double descriptors = 0;
  double heap =
      0;  // bytes; exact without the allocator's own lists (GLIBC_TUNABLES=glibc.malloc.tcache_count=0)
  double resident = 0;  // bytes
};

inline Held WhatIsHeld() {
  Held held;
  const std::filesystem::directory_iterator descriptors("/proc/self/fd");
  held.descriptors = static_cast<double>(std::distance(begin(descriptors), end(descriptors)));
  const auto heap = ::mallinfo2();
  held.heap = static_cast<double>(heap.uordblks + heap.hblkhd);
  double all_pages = 0, resident_pages = 0;
  std::ifstream("/proc/self/statm") >> all_pages >> resident_pages;
  held.resident = resident_pages * static_cast<double>(::sysconf(_SC_PAGESIZE));
  return held;
}

// Runs the event loop for `ms` milliseconds; what all threads of the process used of a core meanwhile, in percent.
inline double CpuPercentWhileIdle(int ms) {
  QEventLoop loop;
  QTimer::singleShot(ms, Qt::PreciseTimer, &loop, &QEventLoop::quit);
  const std::clock_t begin = std::clock();
  loop.exec();
  return 100 * static_cast<double>(std::clock() - begin) / CLOCKS_PER_SEC * 1000 / ms;
}

}  // namespace tendril::test
