#include "platform/process_list.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "platform/system_processes.h"

#ifndef _WIN32
#include <signal.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#endif

namespace tendril::test {
namespace {

TEST(ProcessList, OwnProgram_Runs) {
  EXPECT_TRUE(OpenProcessList()->IsRunning("Platform_Core_Tests") ||
              OpenProcessList()->IsRunning("Platform_Core_Tests.EXE"));
  EXPECT_FALSE(OpenProcessList()->IsRunning("latform_core_tests"));
}

#ifndef _WIN32

namespace fs = std::filesystem;

class Process {
 public:
  Process(const std::string& program, const std::vector<std::string>& arguments) : id_(::fork()) {
    if (id_ != 0) return;
    std::vector<char*> pointers;
    for (const std::string& argument : arguments) pointers.push_back(const_cast<char*>(argument.data()));
    pointers.push_back(nullptr);
    ::execv(program.c_str(), pointers.data());
    ::_exit(1);
  }
  ~Process() { ::waitpid(id_, nullptr, 0); }

  // Ends it; the destructor takes its entry out of the system's list.
  void End() const {
    ::kill(id_, SIGKILL);
    siginfo_t about;
    ::waitid(P_PID, static_cast<id_t>(id_), &about, WEXITED | WNOWAIT);
  }

 private:
  pid_t id_;
};

TEST(ProcessList, RunningProgram_IsFoundByItsNameOrTheFileThatItRuns) {
  std::string name = fs::temp_directory_path() / "tendril-processes-XXXXXX";
  const fs::path folder = ::mkdtemp(name.data());
  const fs::path copy = folder / "TestTray.exe";
  const fs::path sleep = fs::canonical("/bin/sleep");
  fs::copy_file(sleep, copy);
  // An interpreter that reads its program waits for the other end of the pipe.
  ASSERT_EQ(::mkfifo((folder / "testtray.exe").c_str(), 0600), 0);

  const std::unique_ptr<ProcessList> processes = OpenProcessList();
  const struct {
    std::string program;
    std::vector<std::string> arguments;
    const char* seen_as;
  } cases[] = {{copy, {"x", "60"}, "TestTray.exe"},
               {sleep, {"Z:\\opt\\show\\TESTTRAY.EXE", "60"}, "TestTray.exe"},
               {"/bin/sh", {"sh", folder / "testtray.exe"}, "TestTray.exe"},
               {sleep, {"/opt/NotTestTray.exe", "60"}, "NotTestTray.exe"}};
  for (const auto& process : cases) {
    SCOPED_TRACE(process.arguments.front());
    const Process running(process.program, process.arguments);
    // The system knows the arguments of a process a moment later than the process.
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!processes->IsRunning(process.seen_as) && std::chrono::steady_clock::now() < deadline) {
    }
    EXPECT_TRUE(processes->IsRunning(process.seen_as));
    EXPECT_EQ(processes->IsRunning("TestTray.exe"), process.seen_as == std::string("TestTray.exe"));
    running.End();
    EXPECT_FALSE(processes->IsRunning(process.seen_as));
  }
  fs::remove_all(folder);
}

#endif

}  // namespace
}  // namespace tendril::test
