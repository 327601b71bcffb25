// tendril-demo: the utility's window on a virtual bench inside the process, for trying it without hardware.
#include <QApplication>
#include <QCommandLineParser>
#include <cstdlib>

#include "app/caller_terminal.h"
#include "app/demo_program.h"
#include "app/system_appearance.h"
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
  if (!parser.parse(QCoreApplication::arguments())) {
    tendril::ShowInTerminal(
        tendril::Stream::kError,
        QStringLiteral("%1: %2\n").arg(QCoreApplication::applicationName(), parser.errorText()));
    return EXIT_FAILURE;
  }
  if (parser.isSet(QStringLiteral("help"))) {
    tendril::ShowInTerminal(tendril::Stream::kOutput, parser.helpText());
    return EXIT_SUCCESS;
  }
  parser.process(application);  // the options of Qt
  tendril::FollowSystemAppearance();
  if (parser.isSet(dark)) tendril::SetDarkAppearance(true);
  tendril::DemoProgram program;
  program.window.show();
  return QApplication::exec();
}
