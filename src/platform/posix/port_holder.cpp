#include "platform/posix/port_holder.h"

#include <fstream>
#include <string>

#include "platform/posix/proc_folders.h"
#include "platform/system_processes.h"

namespace tendril {
namespace {

constexpr char kModemManager[] = "ModemManager";

}  // namespace

PortHolder FindPortHolder(const std::filesystem::path& device) {
  PortHolder holder;
  holder.process = ProcessWithOpen(device);
  if (holder.process != 0) {
    std::getline(std::ifstream("/proc/" + std::to_string(holder.process) + "/comm"), holder.program);
  } else if (OpenProcessList()->IsRunning(kModemManager)) {
    holder.program = kModemManager;
  }
  return holder;
}

}  // namespace tendril
