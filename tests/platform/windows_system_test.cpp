#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "platform/paths.h"
#include "platform/port_names.h"
#include "serial/command_log.h"

namespace tendril {
namespace {

TEST(WindowsSystem, CommandLog_IsAtItsFixedPath) {
  const std::filesystem::path folder = "C:\\NYXDev";
  std::filesystem::remove_all(folder);
  EXPECT_EQ(CommandLogPath().string(), "C:\\\\NYXDev\\HUtest.txt");
  FileCommandLog(CommandLogPath()).Append("Command-0-5");
  std::string line;
  std::getline(std::ifstream(folder / "HUtest.txt"), line);
  EXPECT_EQ(line, "Command-0-5");
  std::filesystem::remove_all(folder);
}

TEST(WindowsSystem, NumbersWithoutADevice_AreNotFound) {
  for (const int number : {-1, 0, 251}) EXPECT_EQ(FindSerialDevice(number), std::nullopt) << number;
}

}  // namespace
}  // namespace tendril
