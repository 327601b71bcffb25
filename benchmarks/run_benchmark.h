// The main function of the programs that measure with windows.
#pragma once

#include <QApplication>
#include <cstdio>
#include <cstdlib>
#include <exception>

namespace tendril {

// Offscreen unless told otherwise. `measure` prints what it measured, and returns whether all of it lies within its
// bounds; so does the exit code.
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
