#include "platform/process_list.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "platform/system_processes.h"

#ifndef _WIN32
#include <signal.h>
#include <spawn.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <chrono>
#include <filesystem>
#endif

namespace tendril::test {
namespace {

TEST(ProcessList, OwnProgram_Runs) {
#ifdef _WIN32
  const std::string name = "Platform_Core_Tests.EXE";
#else
  const std::string name = "Platform_Core_Tests";
#endif
  EXPECT_TRUE(OpenProcessList()->IsRunning(name));
  EXPECT_FALSE(OpenProcessList()->IsRunning("x" + name));
}

#ifndef _WIN32

namespace fs = std::filesystem;

class Process {
 public:
  Process(const std::string& program, std::vector<std::string> arguments) {
    std::vector<char*> pointers;
    pointers.reserve(arguments.size() + 1);
    for (std::string& argument : arguments) pointers.push_back(argument.data());
    pointers.push_back(nullptr);
    char* no_environment[] = {nullptr};
    if (::posix_spawn(&id_, program.c_str(), nullptr, nullptr, pointers.data(), no_environment) != 0)
      id_ = -1;
  }
  ~Process() {
    End();
    if (id_ > 0) ::waitpid(id_, nullptr, 0);
  }
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;

  // Ends it, and leaves its entry in the system's list.
  void End() const {
    if (id_ <= 0) return;
    ::kill(id_, SIGKILL);
    siginfo_t about;
    ::waitid(P_PID, static_cast<id_t>(id_), &about, WEXITED | WNOWAIT);
  }

 private:
  pid_t id_ = -1;
};

TEST(ProcessList, RunningProgram_IsFoundByItsNameOrTheFileThatItRuns) {
  std::string name = fs::temp_directory_path() / "tendril-processes-XXXXXX";
  const fs::path folder = ::mkdtemp(name.data());
  const fs::path copy = folder / "TestTray.exe";
  const fs::path sleep = fs::canonical("/bin/sleep");
  fs::copy_file(sleep, copy);

  const std::unique_ptr<ProcessList> processes = OpenProcessList();
  struct Case {
    const char* what;
    std::string program;
    std::vector<std::string> arguments;
    const char* seen_as;
  };
  const Case cases[] = {
      {"its name", copy, {"x", "60"}, "TestTray.exe"},
      {"what it was started as", sleep, {"Z:\\opt\\show\\TESTTRAY.EXE", "60"}, "TestTray.exe"},
      {"what it was started as, without folders", sleep, {"testtray.exe", "60"}, "TestTray.exe"},
      {"what it interprets", "/bin/sh", {"sh", folder / "testtray.exe"}, "TestTray.exe"},
      {"a part of a name", sleep, {"/opt/NotTestTray.exe", "60"}, "NotTestTray.exe"},
  };
  // An interpreter that reads its program waits for the other end of the pipe.
  ASSERT_EQ(::mkfifo((folder / "testtray.exe").c_str(), 0600), 0);
  EXPECT_FALSE(processes->IsRunning("TestTray.exe"));
  for (const Case& process : cases) {
    const Process running(process.program, process.arguments);
    // A process is there a moment before the system knows its arguments.
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!processes->IsRunning(process.seen_as) && std::chrono::steady_clock::now() < deadline) {
    }
    EXPECT_TRUE(processes->IsRunning(process.seen_as)) << process.what;
    EXPECT_EQ(processes->IsRunning("TestTray.exe"), process.seen_as == std::string("TestTray.exe"))
        << process.what;
    running.End();
    EXPECT_FALSE(processes->IsRunning(process.seen_as)) << "it has ended: " << process.what;
  }
  fs::remove_all(folder);
}

#endif

}  // namespace
}  // namespace tendril::test
