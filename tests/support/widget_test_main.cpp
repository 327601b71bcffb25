// The main function of tests that need widgets or an event loop: on the offscreen platform unless the environment names
// another, and with a configuration folder of their own, so that no test uses a device of this computer.
#include <gmock/gmock.h>

#include <QApplication>
#include <QTemporaryDir>

int main(int argc, char** argv) {
  testing::InitGoogleMock(&argc, argv);
  const QTemporaryDir folder;
  qputenv("XDG_CONFIG_HOME", folder.path().toLocal8Bit());
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  const QApplication application(argc, argv);
  QApplication::setQuitOnLastWindowClosed(false);  // a box may be the only window
  return RUN_ALL_TESTS();
}
