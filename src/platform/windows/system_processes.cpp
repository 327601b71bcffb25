#include "platform/system_processes.h"

#include <windows.h>
// After windows.h, which it needs.
#include <tlhelp32.h>

#include <string>

#include "platform/unicode.h"

namespace tendril {
namespace {

bool SameName(const wchar_t* a, const std::u16string& b) {
  const auto* wide = reinterpret_cast<const wchar_t*>(b.c_str());
  return CompareStringOrdinal(a, -1, wide, static_cast<int>(b.size()), TRUE) == CSTR_EQUAL;
}

class SystemProcessList final : public ProcessList {
 public:
  bool IsRunning(std::string_view program) const override {
    const std::u16string name = Utf16(program);
    const HANDLE processes = CreateToolhelp32Snapshot(TH32CS_SNAPPROCESS, 0);
    if (processes == INVALID_HANDLE_VALUE) return false;
    bool running = false;
    PROCESSENTRY32W process = {};
    process.dwSize = sizeof process;
    for (BOOL more = Process32FirstW(processes, &process); more && !running;
         more = Process32NextW(processes, &process)) {
      running = SameName(process.szExeFile, name);
    }
    CloseHandle(processes);
    return running;
  }
};

}  // namespace

std::unique_ptr<ProcessList> OpenProcessList() { return std::make_unique<SystemProcessList>(); }

}  // namespace tendril
