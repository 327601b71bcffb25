// tendril-utility: sets up Tendril units on this computer's serial ports.
#include <QApplication>

#include "app/utility_program.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  tendril::UtilityProgram program;
  program.window.show();
  return QApplication::exec();
}
