// The program up to its first painted window.
#include <QApplication>

#include "app/utility_program.h"
#include "first_paint.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  tendril::UtilityProgram program;
  program.window.resize(1280, 800);  // on any screen
  const tendril::FirstPaint first_paint;
  program.window.show();
  return QApplication::exec();
}
