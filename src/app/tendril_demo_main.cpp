// tendril-demo: the utility's window on a virtual bench inside the process, for trying it without hardware.
#include <QApplication>
#include <QCommandLineParser>

#include "app/demo_program.h"
#include "ui/appearance.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  QCommandLineParser parser;
  parser.setApplicationDescription(QStringLiteral(
      "The Tendril Configuration Utility on a virtual bench. Comm 1 has working units at 01 and 0A, Comm 2 "
      "has "
      "one fresh from the factory at FF, Comm 3 is held by a Control Panel that can be asked for it, and on "
      "Comm 4 no unit answers."));
  parser.addHelpOption();
  const QCommandLineOption dark(QStringLiteral("dark"), QStringLiteral("Light text on a dark background."));
  parser.addOption(dark);
  parser.process(application);
  if (parser.isSet(dark)) tendril::SetDarkAppearance(true);
  tendril::DemoProgram program;
  program.window.show();
  return QApplication::exec();
}
