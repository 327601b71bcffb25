// tendril-utility: sets up Tendril units on this computer's serial ports.
#include <QApplication>

#include "app/quit_on_signal.h"
#include "app/system_appearance.h"
#include "app/utility_program.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
#ifndef _WIN32                                 // there the system closes the window instead
  const tendril::QuitOnSignal quit_on_signal;  // a port is given back then too
#endif
  tendril::FollowSystemAppearance();
  tendril::UtilityProgram program;
  program.window.show();
  return QApplication::exec();
}
