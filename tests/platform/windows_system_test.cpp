#include <gtest/gtest.h>
#include <windows.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "platform/paths.h"
#include "platform/standard_streams.h"
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

// What is written to standard output, in a file whose name no code page has.
std::string Written(std::string_view text) {
  const std::filesystem::path path = std::filesystem::temp_directory_path() / u"J\u00FCrgen \u592A\u90CE.txt";
  const HANDLE before = ::GetStdHandle(STD_OUTPUT_HANDLE);
  const HANDLE file = ::CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
  ::SetStdHandle(STD_OUTPUT_HANDLE, file);
  EXPECT_FALSE(WriteAll(Stream::kOutput, text));
  EXPECT_EQ(TerminalColumns(Stream::kOutput), 0);
  EXPECT_FALSE(IsTerminal(Stream::kOutput) || TerminalHasColours(Stream::kOutput));
  ::SetStdHandle(STD_OUTPUT_HANDLE, before);
  ::CloseHandle(file);
  std::ifstream written(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(written), {}};
}

TEST(WindowsSystem, TextInAFile_IsAsItIs) {
  constexpr char kText[] = "port  \xC2\xB5s\n1     1500\n\xE2\x89\xA0 \xE5\xA4\xAA\n";
  EXPECT_EQ(Written(kText), kText);
}

TEST(WindowsSystem, PipeThatNothingReads_HasAReasonWithoutAStop) {
  HANDLE reader = nullptr;
  HANDLE writer = nullptr;
  ASSERT_TRUE(::CreatePipe(&reader, &writer, nullptr, 0));
  ::CloseHandle(reader);
  const HANDLE before = ::GetStdHandle(STD_OUTPUT_HANDLE);
  ::SetStdHandle(STD_OUTPUT_HANDLE, writer);
  const std::error_code fault = WriteAll(Stream::kOutput, "text");
  ::SetStdHandle(STD_OUTPUT_HANDLE, before);
  ::CloseHandle(writer);
  EXPECT_TRUE(fault);
  EXPECT_NE(ReasonText(fault), "");
  EXPECT_NE(ReasonText(fault).back(), '.');
  EXPECT_EQ(ReasonText({ERROR_FILE_NOT_FOUND, std::system_category()}).find_last_of(".\r\n"),
            std::string::npos);
}

}  // namespace
}  // namespace tendril
