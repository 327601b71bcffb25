#include "serial/command_log.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

TEST(FileCommandLog, MakesItsFolderAppendsAndFailsWhenItCannot) {
  const std::filesystem::path folder =
      std::filesystem::path(testing::TempDir()) /
      ("tendril-log-" + std::to_string(testing::UnitTest::GetInstance()->random_seed()));
  std::filesystem::remove_all(folder);
  const std::filesystem::path path = folder / "deep" / "log.txt";
  FileCommandLog(path).Append("Command-0-5");
  FileCommandLog(path).Append("Command-0-6");
  std::stringstream content;
  content << std::ifstream(path).rdbuf();
  EXPECT_EQ(content.str(), "Command-0-5\nCommand-0-6\n");

  // A folder stands where the file should be.
  EXPECT_THROW(FileCommandLog(folder / "deep").Append("Command"), RuntimeError);
  std::filesystem::remove_all(folder);
}

}  // namespace
}  // namespace tendril
