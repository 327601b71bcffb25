#include "platform/system_processes.h"

#include <algorithm>
#include <string>
#include <system_error>
#include <vector>

#include "platform/ascii.h"

#ifdef __APPLE__
#include <sys/sysctl.h>

#include <cstring>
#else
#include <filesystem>
#include <fstream>

#include "platform/posix/proc_folders.h"
#endif

namespace tendril {
namespace {

// The names of a process. Each may be empty.
struct ProcessNames {
  std::string program;
  std::string first_argument;
  std::string second_argument;
};

bool SameName(std::string_view a, std::string_view b) {
  return std::ranges::equal(a, b, {}, AsciiUpper<char>, AsciiUpper<char>);
}

// A file's name without its folders, which may be in the notation of any system.
std::string_view WithoutFolders(std::string_view path) { return path.substr(path.find_last_of("/\\") + 1); }

bool IsNamed(const ProcessNames& names, std::string_view program) {
  return SameName(names.program, program) || SameName(WithoutFolders(names.first_argument), program) ||
         SameName(WithoutFolders(names.second_argument), program);
}

#ifdef __APPLE__

std::vector<kinfo_proc> AllProcesses() {
  int query[] = {CTL_KERN, KERN_PROC, KERN_PROC_ALL};
  std::size_t size = 0;
  if (::sysctl(query, 3, nullptr, &size, nullptr, 0) != 0) return {};
  constexpr std::size_t kSpare = 32;  // for processes that start meanwhile
  std::vector<kinfo_proc> processes(size / sizeof(kinfo_proc) + kSpare);
  size = processes.size() * sizeof(kinfo_proc);
  if (::sysctl(query, 3, processes.data(), &size, nullptr, 0) != 0) return {};
  processes.resize(size / sizeof(kinfo_proc));
  return processes;
}

// The system's text: the number of arguments, the program's path, zeros, and the arguments with a zero after each.
void ReadArguments(pid_t process, ProcessNames& names) {
  int query[] = {CTL_KERN, KERN_PROCARGS2, process};
  std::size_t size = 0;
  if (::sysctl(query, 3, nullptr, &size, nullptr, 0) != 0) return;
  std::string text(size, '\0');
  if (::sysctl(query, 3, text.data(), &size, nullptr, 0) != 0 || size < sizeof(int)) return;
  text.resize(size);
  int count = 0;
  std::memcpy(&count, text.data(), sizeof count);
  const std::size_t begin = text.find_first_not_of('\0', text.find('\0', sizeof count));
  if (begin == text.npos) return;
  if (count > 0) names.first_argument = text.c_str() + begin;
  const std::size_t second = begin + names.first_argument.size() + 1;
  if (count > 1 && second < text.size()) names.second_argument = text.c_str() + second;
}

bool AnyIsNamed(std::string_view program) {
  const std::vector<kinfo_proc> processes = AllProcesses();
  return std::any_of(processes.begin(), processes.end(), [&](const kinfo_proc& process) {
    if (process.kp_proc.p_stat == SZOMB) return false;
    ProcessNames names;
    names.program = process.kp_proc.p_comm;
    ReadArguments(process.kp_proc.p_pid, names);
    return IsNamed(names, program);
  });
}

#else

namespace fs = std::filesystem;

ProcessNames NamesOf(const fs::path& process) {
  ProcessNames names;
  std::getline(std::ifstream(process / "comm"), names.program);
  std::ifstream arguments(process / "cmdline");
  std::getline(arguments, names.first_argument, '\0');
  std::getline(arguments, names.second_argument, '\0');
  return names;
}

// Whether the process has ended and only its entry is left. The state follows the name, which is in brackets and may
// contain any character.
bool HasEnded(const fs::path& process) {
  std::string about;
  std::getline(std::ifstream(process / "stat"), about, '\0');
  const std::size_t end_of_name = about.rfind(") ");
  if (end_of_name == about.npos) return true;
  const char state = about[end_of_name + 2];
  return state == 'Z' || state == 'X';
}

bool AnyIsNamed(std::string_view program) {
  return AnyProcess(
      [&](const fs::path& process) { return IsNamed(NamesOf(process), program) && !HasEnded(process); });
}

#endif

class SystemProcessList final : public ProcessList {
 public:
  bool IsRunning(std::string_view program) const override { return AnyIsNamed(program); }
};

}  // namespace

std::unique_ptr<ProcessList> OpenProcessList() { return std::make_unique<SystemProcessList>(); }

}  // namespace tendril
