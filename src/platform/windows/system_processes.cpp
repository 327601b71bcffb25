#include "platform/system_processes.h"

#include <windows.h>
// After windows.h, which it needs.
#include <tlhelp32.h>

#include <string>

#include "platform/windows/wide_text.h"

namespace tendril {
namespace {

class SystemProcessList final : public ProcessList {
 public:
  bool IsRunning(std::string_view program) const override {
    const std::wstring name = WideText(program);
    const HANDLE processes = CreateToolhelp32Snapshot(TH32CS_SNAPPROCESS, 0);
    if (processes == INVALID_HANDLE_VALUE) return false;
    bool running = false;
    PROCESSENTRY32W process = {};
    process.dwSize = sizeof process;
    for (BOOL more = Process32FirstW(processes, &process); more && !running;
         more = Process32NextW(processes, &process)) {
      running = EqualNames(process.szExeFile, name);
    }
    CloseHandle(processes);
    return running;
  }
};

}  // namespace

std::unique_ptr<ProcessList> OpenProcessList() { return std::make_unique<SystemProcessList>(); }

}  // namespace tendril
