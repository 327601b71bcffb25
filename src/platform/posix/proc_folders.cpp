#include "platform/posix/proc_folders.h"

#include <unistd.h>

#include <string>
#include <system_error>

namespace tendril {

namespace fs = std::filesystem;

bool AnyProcess(const std::function<bool(const fs::path& process)>& matches) {
  std::error_code error;
  for (fs::directory_iterator entry("/proc", error), end; !error && entry != end; entry.increment(error)) {
    const fs::path& folder = entry->path();
    const bool is_process = folder.filename().string().find_first_not_of("0123456789") == std::string::npos;
    if (is_process && matches(folder)) return true;
  }
  return false;
}

std::int64_t ProcessWithOpen(const fs::path& device) {
  const std::string self = std::to_string(::getpid());
  std::int64_t found = 0;
  AnyProcess([&](const fs::path& process) {
    if (process.filename() == self) return false;
    std::error_code error;
    for (fs::directory_iterator entry(process / "fd", error), end; !error && entry != end;
         entry.increment(error)) {
      std::error_code closed_meanwhile;
      if (fs::read_symlink(entry->path(), closed_meanwhile) != device) continue;
      found = std::stoll(process.filename().string());
      return true;
    }
    return false;
  });
  return found;
}

}  // namespace tendril
