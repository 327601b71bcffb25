#include <gmock/gmock.h>

#include <QTemporaryDir>
#include <fstream>

#include "platform/paths.h"
#include "platform/port_names.h"

namespace tendril::test {
namespace {

TEST(SystemPaths, CommandLog_FollowsTheEnvironmentAndIgnoresRelativeFolders) {
  const QByteArray home_before = qgetenv("HOME");
  qputenv("HOME", "/home/anna");
  for (const char* no_folder : {"", "relative"}) {
    qputenv("XDG_STATE_HOME", no_folder);
    EXPECT_EQ(CommandLogPath(), "/home/anna/.local/state/kelvane/HUtest.txt") << no_folder;
  }
  qputenv("XDG_STATE_HOME", "/srv/x");
  EXPECT_EQ(CommandLogPath(), "/srv/x/kelvane/HUtest.txt");
  qunsetenv("XDG_STATE_HOME");
  qputenv("HOME", home_before);
}

#ifdef __linux__
TEST(PortNames, NumbersWithoutALink_StandForTheDriversDevices) {
  for (const auto& [number, device] :
       {std::pair(0, ""), std::pair(1, "/dev/ttyS0"), std::pair(4, "/dev/ttyS3"),
        std::pair(5, "/dev/ttyUSB0"), std::pair(15, "/dev/ttyACM0"), std::pair(24, "/dev/ttyACM9"),
        std::pair(25, "")}) {
    EXPECT_EQ(DefaultSerialDevice(number), device) << number;
  }
}

TEST(PortNames, UartThatTheDriverDidNotFind_IsNoHardware) {
  const QTemporaryDir folder;
  const std::filesystem::path tty_class = folder.path().toStdString();
  for (const std::string device : {"ttyS0", "ttyS1"}) {
    std::filesystem::create_directory(tty_class / device);
    std::ofstream(tty_class / device / "type") << (device == "ttyS0" ? "4\n" : "0\n");
  }
  EXPECT_TRUE(DriverFoundHardware("/dev/ttyS0", tty_class));
  EXPECT_FALSE(DriverFoundHardware("/dev/ttyS1", tty_class));
  EXPECT_TRUE(DriverFoundHardware("/dev/ttyUSB0", tty_class)) << "a driver that gives no type";
}

TEST(PortNames, Description_IsTheAdaptersOwnAndNotItsHubs) {
  const QTemporaryDir folder;
  const std::filesystem::path usb = folder.path().toStdString();
  const std::filesystem::path hub = usb / "hub", adapter = hub / "adapter", tty = adapter / "tty" / "ttyUSB0";
  std::filesystem::create_directories(tty);
  std::filesystem::create_directory_symlink(tty, usb / "ttyUSB0");
  std::ofstream(hub / "idVendor") << "1d6b\n";
  std::ofstream(hub / "product") << "Hub\n";
  std::ofstream(adapter / "idVendor") << "1a86\n";
  EXPECT_EQ(DescribeSerialDevice("/dev/ttyUSB0", usb).Text(), "/dev/ttyUSB0");
  std::ofstream(adapter / "product") << "USB Serial\n";
  std::ofstream(adapter / "manufacturer") << "Maker\n";
  EXPECT_EQ(DescribeSerialDevice("/dev/ttyUSB0", usb).Text(), "USB Serial (Maker), /dev/ttyUSB0");
  EXPECT_EQ(DescribeSerialDevice("/dev/ttyS0", usb).Text(), "/dev/ttyS0");
}
#endif

}  // namespace
}  // namespace tendril::test
