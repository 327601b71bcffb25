// The program up to its first painted window. "first_window --count" prints how many controls that has.
#include <QApplication>
#include <cstdio>
#include <cstdlib>

#include "app/utility_program.h"
#include "first_paint.h"
#include "plain_controls.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  tendril::UtilityProgram program;
  program.window.resize(1280, 800);  // on any screen
  if (argc > 1) {
    program.window.show();
    for (const int count : tendril::CountControls(program.window)) std::printf("%d ", count);
    return EXIT_SUCCESS;
  }
  const tendril::FirstPaint first_paint;
  program.window.show();
  return QApplication::exec();
}
